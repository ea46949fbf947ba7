"""Mutants: small changes of the source, each of which some test should notice."""
import hashlib
from dataclasses import dataclass

import statements
from tokens import MARK, NUMBER, WORD, tokenise

# What stands for an operator between two operands.
BINARY = {
    '+': ('arithmetic', '-', '*'), '-': ('arithmetic', '+'), '*': ('arithmetic', '+', '/'),
    '/': ('arithmetic', '*'), '%': ('arithmetic', '/', '*'),
    '<<': ('shift', '>>'), '>>': ('shift', '<<'),
    '&': ('bitwise', '|', '^'), '|': ('bitwise', '&', '^'), '^': ('bitwise', '&', '|'),
    '&&': ('logical', '||'), '||': ('logical', '&&'),
    '<': ('relational', '<=', '>='), '<=': ('relational', '<', '>'),
    '>': ('relational', '>=', '<'), '>=': ('relational', '>', '<='),
    '==': ('relational', '!='), '!=': ('relational', '=='),
    '+=': ('assignment', '-=', '='), '-=': ('assignment', '+=', '='),
    '*=': ('assignment', '/=', '='), '/=': ('assignment', '*=', '='),
    '%=': ('assignment', '/=', '='), '|=': ('assignment', '&=', '='),
    '&=': ('assignment', '|=', '='), '^=': ('assignment', '|=', '='),
    '<<=': ('assignment', '>>='), '>>=': ('assignment', '<<='),
}
UNARY = {'!': '', '~': '', '-': '', '++': '--', '--': '++'}
_OPERAND_ENDS = (')', ']', '}')


@dataclass(frozen=True)
class Mutant:
    """One change. key says which change it is, whatever lines are added or taken elsewhere."""
    file: str
    line: int
    column: int  # within source, from 1
    source: str  # the line, without indentation
    nth: int  # of the lines of the file with this text
    operator: str
    before: str
    after: str
    start: int
    end: int
    key: str

    def apply(self, text):
        """The whole file with the change."""
        return text[:self.start] + self.after + text[self.end:]

    def change(self):
        """The change in one line."""
        return f'{squeezed(self.before)} -> {squeezed(self.after) or "(nothing)"}'


def squeezed(text):
    """Text with its white space as single blanks."""
    return ' '.join(text.split())


def _number_value(text):
    """Value of an integer literal and its suffix; None for any other number."""
    digits = text.replace("'", '').rstrip('uUlL')
    suffix = text[len(text.rstrip('uUlL')):]
    try:
        return int(digits, 0), suffix
    except ValueError:
        return None


def _constants(tokens, index):
    """Other values for a literal; the extent of an array that is declared stays as it is."""
    token = tokens[index]
    if token.text in ('true', 'false'):
        yield 'constant', 'false' if token.text == 'true' else 'true'
    value = _number_value(token.text) if token.kind == NUMBER else None
    if value is None or _is_extent(tokens, index):
        return
    number, suffix = value
    for other in dict.fromkeys((number + 1, number - 1, 0, 1)):
        if other != number:
            yield 'constant', f'{other}{suffix}' if other >= 0 else f'({other})'


def _is_extent(tokens, index):
    """The number alone in brackets behind a name that is being declared."""
    if index < 3 or tokens[index - 1].text != '[' or tokens[index + 1].text != ']':
        return False
    opening = index - 1
    while tokens[opening - 1].text == ']':  # further extents before it
        opening -= 3
    return tokens[opening - 1].kind == WORD and (
        tokens[opening - 2].kind == WORD or
        tokens[opening - 2].text in ('*', '&', '>') and not tokens[opening - 2].spaced)


def _operators(tokens, index):
    """Other operators for the one at index; none for marks that are not one."""
    token, before = tokens[index], tokens[index - 1] if index else None
    if token.kind != MARK or before is None or before.text == 'operator':
        return
    if token.text in BINARY and token.spaced:
        kind, *others = BINARY[token.text]
        for other in others:
            yield kind, other
        return
    ends_operand = before.kind in (WORD, NUMBER) and before.text not in ('return', 'case') or \
        before.text in _OPERAND_ENDS
    if token.text in UNARY and (token.text in ('++', '--') or not ends_operand):
        yield 'unary', UNARY[token.text]


def _raw_changes(tokens):
    """All changes as (start, end, operator, after), in the order of the source."""
    for index, token in enumerate(tokens):
        for operator, after in (*_operators(tokens, index), *_constants(tokens, index)):
            yield token.start, token.end, operator, after
    yield from statements.changes(tokens)


def mutants_of(file, text):
    """All mutants of a file, by their place."""
    found, seen, nths = [], {}, _nth_of_lines(text)
    for start, end, operator, after in sorted(set(_raw_changes(tokenise(text)))):
        line = text.count('\n', 0, start) + 1
        line_start = text.rfind('\n', 0, start) + 1
        source = text[line_start:].split('\n', 1)[0]
        column = 1 + start - line_start - (len(source) - len(source.lstrip()))
        identity = (file, source.strip(), column, operator, squeezed(text[start:end]), after)
        seen[identity] = seen.get(identity, 0) + 1
        key = hashlib.sha1(repr((identity, seen[identity])).encode()).hexdigest()[:12]
        found.append(Mutant(file, line, column, source.strip(), nths[line - 1], operator,
                            text[start:end], after, start, end, key))
    return found


def _nth_of_lines(text):
    """For each line, which of the lines with its text it is, from 1."""
    counts, nths = {}, []
    for line in text.splitlines():
        counts[line.strip()] = counts.get(line.strip(), 0) + 1
        nths.append(counts[line.strip()])
    return nths
