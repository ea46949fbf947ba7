"""Mutants of whole conditions and statements: forced, left out, or returning nothing."""
from tokens import MARK, WORD, closing

_NOT_EXPRESSIONS = {'if', 'else', 'for', 'while', 'do', 'switch', 'case', 'default', 'return',
                    'break', 'continue', 'goto', 'const', 'constexpr', 'static', 'using',
                    'namespace', 'struct', 'class', 'enum', 'union', 'template', 'typedef',
                    'inline', 'extern', 'explicit', 'static_assert', 'auto', 'public', 'private'}
_PLAIN_RETURNS = ({'0'}, {'true'}, {'false'}, {'{', '}'}, {'nullptr'}, {'std', '::', 'nullopt'})
_CONDITION_STARTS = {'=', ',', ';', '{', '}', '?', ':', 'return', '+=', '-=', '|=', '<<'}


def _conditions(tokens):
    """if and while: true or false; for: false. An endless loop would only cost time."""
    for index, token in enumerate(tokens):
        if token.text not in ('if', 'while', 'for') or token.kind != WORD:
            continue
        opening = index + 1 + (tokens[index + 1].text == 'constexpr')
        first, last = opening + 1, closing(tokens, opening) - 1
        if token.text == 'for':
            semicolons = _at_depth(tokens, first, last, ';')
            if len(semicolons) != 2:
                continue
            first, last = semicolons[0] + 1, semicolons[1] - 1
        if first > last or tokens[first].text in ('true', 'false') and first == last:
            continue
        for value in ('true', 'false') if token.text == 'if' else ('false',):
            yield tokens[first].start, tokens[last].end, 'condition', value


def _choices(tokens):
    """The condition of a ?: as true or false."""
    for index, token in enumerate(tokens):
        if token.text != '?' or token.kind != MARK:
            continue
        first, depth = index, 0
        while first > 0:
            text = tokens[first - 1].text
            depth += (text in (')', ']')) - (text in ('(', '['))
            if depth < 0 or depth == 0 and text in _CONDITION_STARTS:
                break
            first -= 1
        for value in ('true', 'false'):
            yield tokens[first].start, tokens[index - 1].end, 'condition', value


def _at_depth(tokens, first, last, text):
    """Indices of a mark between first and last that stands in no bracket."""
    found, depth = [], 0
    for index in range(first, last + 1):
        depth += (tokens[index].text in '([{') - (tokens[index].text in ')]}')
        if depth == 0 and tokens[index].text == text:
            found.append(index)
    return found


def _statement_starts(tokens):
    """Indices at which a statement begins."""
    for index, token in enumerate(tokens):
        if token.kind == MARK and token.text in (';', '{', '}') or token.text == 'else':
            yield index + 1
        elif token.text in ('if', 'for', 'while') and token.kind == WORD:
            yield closing(tokens, index + 1 + (tokens[index + 1].text == 'constexpr')) + 1


def _end_of(tokens, first):
    """Index of the statement's semicolon; None when it has none of its own."""
    depth = 0
    for index in range(first, len(tokens)):
        text = tokens[index].text
        if depth == 0 and text == ';':
            return index
        depth += (text in ('(', '[', '{')) - (text in (')', ']', '}'))
        if depth < 0:
            return None
    return None


def _is_declaration(tokens, first):
    """A type and a name stand at the beginning, or it is no expression at all."""
    if tokens[first].text in _NOT_EXPRESSIONS or tokens[first].kind not in (WORD, MARK):
        return True
    if tokens[first].kind == MARK:
        return tokens[first].text not in ('*', '++', '--', '(')
    index = first + 1
    while tokens[index].text == '::':
        index += 2
    if tokens[index].text == '<' and not tokens[index].spaced:
        return True
    while tokens[index].text in ('*', '&') and not tokens[index].spaced:
        index += 1
    return tokens[index].kind == WORD


def _deletions(tokens):
    """Expression statements, break, continue and a bare return, each left out."""
    loop_heads = _loop_heads(tokens)
    for first in sorted(set(_statement_starts(tokens))):
        if first >= len(tokens) or first in loop_heads:
            continue
        last = _end_of(tokens, first)
        if last is None or last == first:
            continue
        jump = tokens[first].text in ('break', 'continue', 'return') and last == first + 1
        if jump or not _is_declaration(tokens, first):
            yield tokens[first].start, tokens[last - 1].end, 'deletion', ''


def _loop_heads(tokens):
    """Indices within the brackets of a for: its parts are no statements."""
    inside = set()
    for index, token in enumerate(tokens):
        if token.text == 'for' and token.kind == WORD:
            inside.update(range(index + 1, closing(tokens, index + 1)))
    return inside


def _returns(tokens):
    """return of anything but a plain nothing: of the type's zero."""
    for index, token in enumerate(tokens):
        if token.text != 'return' or token.kind != WORD:
            continue
        last = _end_of(tokens, index + 1)
        if last is None or last == index + 1:
            continue
        value = {t.text for t in tokens[index + 1:last]}
        if value not in _PLAIN_RETURNS:
            yield tokens[index + 1].start, tokens[last - 1].end, 'return', '{}'


def changes(tokens):
    """All of them as (start, end, operator, after)."""
    for find in (_conditions, _choices, _deletions, _returns):
        yield from find(tokens)
