"""Which file includes which, and where that breaks the order of the tree.

The order of the module's folders is the one that docs/architecture.md states.
"""
import pathlib
import posixpath
import re

MODULE = 'fpsvc/callib/FpNavi'
_PUBLIC = 'fpsvc/callib/inc'
_LOG = 'devhal/alog'

# What files of a directory include besides those of their own. The longest prefix counts.
_ALLOWED = {
    MODULE: [_PUBLIC, 'devhal/alog/inc'],
    'fpsvc/callib/FingerDetect': [_PUBLIC],
    _PUBLIC: [],
    _LOG: [],
    'examples': [_PUBLIC, _LOG],
    'host': [MODULE, _PUBLIC, _LOG],
    'tools': ['host', MODULE, _PUBLIC, _LOG],
    'tests/reference': [],
    'tests/install': [_PUBLIC, _LOG],
    'tests/support': ['host', MODULE, _PUBLIC, _LOG],
    'tests': ['host', MODULE, _PUBLIC, _LOG],
    'fuzz': ['tests', 'host', MODULE, _PUBLIC, _LOG],
    'bench': ['tests', 'host', MODULE, _PUBLIC, _LOG],
}
# Where the compiler looks for a header, besides the folder of the file that includes it.
_SEARCHED = [MODULE, _PUBLIC, 'devhal/alog/inc', _LOG, 'host', 'tests/support', 'tests/reference',
             'tests/compare', 'tests/host', 'tests/golden', 'tests/digest', 'tests/presence',
             'tests/reliability', 'fuzz', 'bench', 'examples', 'tools/fpnavi']
_QUOTED = re.compile(r'^\s*#\s*include\s+"([^"]+)"', re.MULTILINE)


def folders_in_order(root):
    """The module's folders as docs/architecture.md has them, the lowest first."""
    text = (pathlib.Path(root) / 'docs/architecture.md').read_text(encoding='utf-8')
    stated = re.search(r'folders in this order:((?:\s+`\w+`[,.])+)', text)
    return re.findall(r'\w+', stated.group(1)) if stated else []


def read_includes(root):
    """{file: the files that it includes in quotes}. One that is not found keeps its bare name."""
    texts = read_sources(root)
    return {file: [_resolved(header, file, texts) for header in _QUOTED.findall(text)]
            for file, text in texts.items()}


def read_sources(root):
    """{file: text} of the C and C++ files of the tree, by their paths in it."""
    root = pathlib.Path(root)
    tops = sorted({name.split('/')[0] for name in _ALLOWED})
    return {path.relative_to(root).as_posix(): path.read_text(encoding='utf-8')
            for top in tops for path in sorted((root / top).rglob('*.*'))
            if path.suffix in ('.h', '.c', '.cpp')}


def _resolved(header, file, files):
    for folder in [file.rpartition('/')[0], *_SEARCHED]:
        path = posixpath.normpath(f'{folder}/{header}')
        if path in files:
            return path
    return header


def strangers(includes):
    """Includes of what a directory may not include, and of headers that are not there."""
    found = []
    for file, headers in includes.items():
        home = max((name for name in _ALLOWED if file.startswith(f'{name}/')), key=len)
        allowed = tuple(f'{name}/' for name in [home, *_ALLOWED[home]])
        found += [f'{file} includes {header}' for header in headers
                  if not header.startswith(allowed)]
    return found


def upward(includes, order):
    """Includes of a folder of the module by a file of a folder before it."""
    found = []
    for file, headers in includes.items():
        for header in headers:
            if file.startswith(f'{MODULE}/') and header.startswith(f'{MODULE}/'):
                here, there = (order.index(name.split('/')[3]) for name in (file, header))
                if there > here:
                    found.append(f'{file} includes {header}')
    return found


def circles(includes):
    """Pairs of .h and .cpp that include each other, directly or by others: names joined by ' > '."""
    graph = {}
    for file, headers in includes.items():
        node = file.rpartition('.')[0]
        graph.setdefault(node, set()).update(header.rpartition('.')[0] for header in headers)
        graph[node].discard(node)
    found = set()
    for start in graph:
        way = _way_back(graph, start)
        if way:
            first = way.index(min(way))
            found.add(' > '.join([*way[first:], *way[:first], way[first]]))
    return sorted(found)


def _way_back(graph, start):
    """The shortest way from a node to itself, or nothing."""
    ways = [[start]]
    seen = set()
    while ways:
        way = ways.pop(0)
        for node in sorted(graph.get(way[-1], ())):
            if node == start:
                return way
            if node not in seen:
                seen.add(node)
                ways.append([*way, node])
    return []
