"""Which file includes which, and where that breaks the order of the tree.

The order of the folders of the module and of the host side is the one that docs/architecture.md
states.
"""
import pathlib
import posixpath
import re

MODULE = 'fpsvc/callib/FpNavi'
HOST = 'host'
_PUBLIC = 'fpsvc/callib/inc'
_LOG = 'devhal/alog'

# What files of a directory include besides those of their own. The longest prefix counts.
_ALLOWED = {
    MODULE: [_PUBLIC, 'devhal/alog/inc'],
    'fpsvc/callib/FingerDetect': [_PUBLIC],
    _PUBLIC: [],
    _LOG: [],
    'examples': [_PUBLIC, _LOG],
    HOST: [_PUBLIC],
    'host/replay': [HOST, MODULE, _PUBLIC],
    'tools': [HOST, MODULE, _PUBLIC, _LOG],
    'tests/reference': [],
    'tests/install': [_PUBLIC, _LOG],
    'tests/support': [HOST, MODULE, _PUBLIC, _LOG],
    'tests': [HOST, MODULE, _PUBLIC, _LOG],
    'fuzz': ['tests', HOST, MODULE, _PUBLIC, _LOG],
    'bench': ['tests', HOST, MODULE, _PUBLIC, _LOG],
}
# Where the compiler looks for a header, besides the folder of the file that includes it.
_SEARCHED = [MODULE, _PUBLIC, 'devhal/alog/inc', _LOG, HOST, 'tests/support', 'tests/reference',
             'tests/compare', 'tests/host', 'tests/golden', 'tests/digest', 'tests/presence',
             'tests/reliability', 'fuzz', 'bench', 'examples', 'tools/fpnavi']
# Directories whose folders have an order, and how the sentence that states it begins.
_ORDERED = {MODULE: 'The module', HOST: 'The host side'}
_QUOTED = re.compile(r'^\s*#\s*include\s+"([^"]+)"', re.MULTILINE)


def folders_in_order(root, directory):
    """Folders of MODULE or HOST as docs/architecture.md has them, the lowest first."""
    text = (pathlib.Path(root) / 'docs/architecture.md').read_text(encoding='utf-8')
    sentence = f'{_ORDERED[directory]} has its folders in this order:'.replace(' ', r'\s+')
    stated = re.search(sentence + r'((?:\s+`\w+`[,.])+)', text)
    return re.findall(r'\w+', stated.group(1)) if stated else []


def folders_with_sources(includes, directory):
    """Folders of a directory that hold sources; a source that is in none has its own name there."""
    return {_folder(file, directory) for file in includes if file.startswith(f'{directory}/')}


def _folder(file, directory):
    return file.removeprefix(f'{directory}/').partition('/')[0]


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


def upward(includes, directory, order):
    """Includes of a folder of MODULE or HOST by a file of a folder before it in the order."""
    def place(file):
        folder = _folder(file, directory)
        return order.index(folder) if folder in order else len(order)

    inside = f'{directory}/'
    return [f'{file} includes {header}' for file, headers in includes.items()
            for header in headers if file.startswith(inside) and header.startswith(inside)
            and place(header) > place(file)]


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
