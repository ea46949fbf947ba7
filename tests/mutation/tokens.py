"""C++ text as tokens, as far as mutation needs them.

Comments, preprocessor lines and white space are left out; strings and characters are tokens of
their own, so that nothing inside them is taken for code. The sources are laid out by clang-format:
a binary operator stands between spaces, the brackets of a template do not.
"""
import re
from dataclasses import dataclass

WORD, NUMBER, TEXT, MARK = 'word', 'number', 'text', 'mark'

_PATTERN = re.compile(r'''
    (?P<comment> //[^\n]* | /\*.*?\*/ )
  | (?P<text> "(?:\\.|[^"\\\n])*" | '(?:\\.|[^'\\\n])*' )
  | (?P<number> \.?\d(?:[eEpP][+-]|[\w.']) * )
  | (?P<word> [A-Za-z_]\w* )
  | (?P<mark> <<= | >>= | \.\.\. | -> | :: | \+\+ | -- | << | >> | <= | >= | == | != | && | \|\|
            | [-+*/%&|^]= | [][{}();:,.?~!<>=+*/%&|^-] )
''', re.VERBOSE | re.DOTALL)


@dataclass(frozen=True)
class Token:
    """A token; spaced: white space stands on both sides of it."""
    kind: str
    text: str
    start: int
    end: int
    spaced: bool


def _without_directives(text):
    """The text with preprocessor lines, and what only another processor compiles, as blanks."""
    kept, inside, foreign = [], False, False
    for line in text.splitlines(keepends=True):
        directive = inside or line.lstrip().startswith('#')
        if directive and not inside and re.match(r'\s*#\s*(if|el|endif)', line):
            foreign = '__ARM' in line
        inside = directive and line.rstrip('\n').endswith('\\')
        kept.append(re.sub(r'[^\n]', ' ', line) if directive or foreign else line)
    return ''.join(kept)


def tokenise(text):
    """The tokens of a file, in order. Raises ValueError where it cannot read on."""
    code = _without_directives(text)
    tokens, at = [], 0
    while at < len(code):
        if code[at].isspace():
            at += 1
            continue
        match = _PATTERN.match(code, at)
        if match is None:
            raise ValueError(f'line {code.count(chr(10), 0, at) + 1}: not understood: '
                             f'{code[at:at + 20]!r}')
        if match.lastgroup != 'comment':
            before, after = code[at - 1:at], code[match.end():match.end() + 1]
            spaced = before.isspace() and (after.isspace() or not after)
            tokens.append(Token(match.lastgroup, match.group(), at, match.end(), spaced))
        at = match.end()
    return tokens


def closing(tokens, opening):
    """Index of the bracket that closes the one at index opening; len(tokens) without one."""
    depth = 0
    for index in range(opening, len(tokens)):
        if tokens[index].kind == MARK:
            depth += (tokens[index].text in '([{') - (tokens[index].text in ')]}')
            if depth == 0:
                return index
    return len(tokens)
