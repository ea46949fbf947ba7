"""Where the braces of if, else, for and while are not as the style of the project has them.

A single simple statement has none, also when it takes two lines. A body of several statements, one
that is a control statement itself and one with a comment of its own have some; so does an assertion
of GoogleTest under an if, since the macro holds an else. Branches of an if are all alike.
"""
import pathlib
import re
import sys
from dataclasses import dataclass

sys.path.insert(0, str(pathlib.Path(__file__).parents[1] / 'mutation'))
from tokens import closing, tokenise

_CONTROL = {'if', 'for', 'while', 'switch', 'do', 'try'}


@dataclass(frozen=True)
class Body:
    """Tokens first to last, braces included where it has some. after: the token that follows."""
    first: int
    last: int
    braced: bool
    simple: bool  # one simple statement, without a comment if braced

    @property
    def after(self):
        return self.last + 1


def _blank(raw_string):
    """A number as long as the raw string, which may have several lines."""
    return '0' + re.sub(r'[^\n]', ' ', raw_string.group()[1:])


class Source:
    """The tokens of a file and where its control statements are."""

    def __init__(self, text):
        self.text = re.sub(r'R"(\w*)\(.*?\)\1"', _blank, text, flags=re.DOTALL)
        self.tokens = tokenise(self.text)

    def text_at(self, i):
        return self.tokens[i].text if i < len(self.tokens) else ''

    def _closing(self, i):
        return closing(self.tokens, i)

    def line(self, i):
        return self.text.count('\n', 0, self.tokens[i].start) + 1

    def statement_end(self, i):
        """The last token of the simple statement that begins at i."""
        while self.text_at(i) != ';':
            i = self._closing(i) + 1 if self.text_at(i) in ('(', '[', '{') else i + 1
            if i >= len(self.tokens):
                raise ValueError('statement without an end')
        return i

    def _simple(self, i, keyword):
        """Whether the statement at i, under the keyword, may stand without braces."""
        assertion = keyword == 'if' and re.match('EXPECT_|ASSERT_', self.text_at(i))
        return not assertion and self.text_at(i) not in _CONTROL | {'{', '}', ';'}

    def body(self, i, keyword):
        """The body that begins at i. One that is a control statement ends with its own body."""
        if self.text_at(i) == '{':
            last = self._closing(i)
            inside = self.text[self.tokens[i].end:self.tokens[last].start]
            simple = (self._simple(i + 1, keyword) and
                      not re.search(r'//|/\*|^\s*#', inside, re.MULTILINE) and
                      self.statement_end(i + 1) == last - 1)
            return Body(i, last, True, simple)
        if self.text_at(i) not in _CONTROL:
            return Body(i, self.statement_end(i), False, self._simple(i, keyword))
        return Body(i, self.chain(i)[-1].last, False, False)

    def chain(self, i):
        """The bodies of the if, for or while at i: of an if with all of its branches."""
        condition = i + 1
        while self.text_at(condition) != '(':  # if constexpr
            condition += 1
        bodies = [self.body(self._closing(condition) + 1, self.text_at(i))]
        after = bodies[0].after
        if self.text_at(i) == 'if' and self.text_at(after) == 'else':
            more = self.text_at(after + 1) == 'if'
            bodies += self.chain(after + 1) if more else [self.body(after + 1, 'if')]
        return bodies

    def chains(self):
        """(first token, bodies) of each if that is not a branch itself, each for and each while."""
        ends_of_do = set()
        for i, token in enumerate(self.tokens):
            if token.text == 'do' and self.text_at(i + 1) == '{':
                ends_of_do.add(self._closing(i + 1) + 1)
            branch = i > 0 and self.text_at(i - 1) == 'else'
            if token.text in ('if', 'for', 'while') and not branch and i not in ends_of_do:
                yield i, self.chain(i)


def findings(text):
    """(line, what is wrong) in the text of a file."""
    source = Source(text)
    found = []
    for i, bodies in source.chains():
        if all(body.braced and body.simple for body in bodies):
            found.append((source.line(i), 'braces around a single statement'))
        elif not all(body.simple for body in bodies) and not all(body.braced for body in bodies):
            found.append((source.line(i), 'a body without braces'))
    return found
