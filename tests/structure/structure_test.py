"""The order of includes and the braces of the tree, and that a breach of either is seen."""
import pathlib
import tempfile
import unittest

import braces
import includes

_ROOT = pathlib.Path(__file__).parents[2]
_MODULE = includes.MODULE
_HOST = includes.HOST


class Includes(unittest.TestCase):
    """Of the tree."""

    @classmethod
    def setUpClass(cls):
        cls.orders = {directory: includes.folders_in_order(_ROOT, directory)
                      for directory in (_MODULE, _HOST)}
        cls.includes = includes.read_includes(_ROOT)

    def test_every_folder_has_its_place(self):
        for directory, order in self.orders.items():
            folders = includes.folders_with_sources(self.includes, directory)
            self.assertEqual(sorted(folders), sorted(order))

    def test_no_folder_of_the_host_side_has_the_name_of_one_of_the_module(self):
        self.assertEqual(set(self.orders[_MODULE]) & set(self.orders[_HOST]), set())

    def test_folders_include_none_above_them(self):
        for directory, order in self.orders.items():
            self.assertEqual(includes.upward(self.includes, directory, order), [])

    def test_nothing_includes_itself_by_others(self):
        found = includes.circles(self.includes)
        self.assertEqual(found, [])

    def test_directories_include_only_what_they_stand_on(self):
        self.assertEqual(includes.strangers(self.includes), [])


class PlantedIncludes(unittest.TestCase):
    """Trees of few files with one breach each."""

    def setUp(self):
        self._directory = tempfile.TemporaryDirectory()
        self.addCleanup(self._directory.cleanup)
        self.root = pathlib.Path(self._directory.name)
        self.write('docs/architecture.md',
                   'The module has its\nfolders in this order: `low`,\n`high`. Then\n`more`.\n'
                   'The host side has its folders in this order: `first`, `last`.')

    def write(self, path, text):
        (self.root / path).parent.mkdir(parents=True, exist_ok=True)
        (self.root / path).write_text(text, encoding='utf-8')

    def write_module(self, path, *headers):
        self.write(f'{_MODULE}/{path}', ''.join(f'#include "{name}"\n' for name in headers))

    def write_host(self, path, *headers):
        self.write(f'{_HOST}/{path}', ''.join(f'#include "{name}"\n' for name in headers))

    def read(self):
        return includes.read_includes(self.root)

    def test_order_ends_with_the_sentence(self):
        self.assertEqual(includes.folders_in_order(self.root, _MODULE), ['low', 'high'])
        self.assertEqual(includes.folders_in_order(self.root, _HOST), ['first', 'last'])

    def test_no_order_without_the_sentence(self):
        self.write('docs/architecture.md', 'The folders: `low`, `high`.')
        self.assertEqual(includes.folders_in_order(self.root, _MODULE), [])
        self.assertEqual(includes.folders_in_order(self.root, _HOST), [])

    def test_folders_with_sources(self):
        self.write_module('low/A.h')
        self.write_host('first/B.cpp')
        self.write_host('C.h')
        self.assertEqual(includes.folders_with_sources(self.read(), _MODULE), {'low'})
        self.assertEqual(includes.folders_with_sources(self.read(), _HOST), {'first', 'C.h'})

    def test_upward_include(self):
        self.write_module('high/B.h')
        self.write_module('low/A.cpp', 'high/B.h')
        self.assertEqual(includes.upward(self.read(), _MODULE, ['low', 'high']),
                         [f'{_MODULE}/low/A.cpp includes {_MODULE}/high/B.h'])
        self.assertEqual(includes.upward(self.read(), _MODULE, ['high', 'low']), [])

    def test_upward_include_by_a_relative_path(self):
        self.write_module('high/B.h')
        self.write(f'{_MODULE}/low/A.cpp', '  #  include "../high/B.h"\n')
        self.assertEqual(includes.upward(self.read(), _MODULE, ['low', 'high']),
                         [f'{_MODULE}/low/A.cpp includes {_MODULE}/high/B.h'])

    def test_upward_include_of_the_host_side(self):
        self.write_host('last/B.h')
        self.write_host('first/A.cpp', 'last/B.h')
        self.assertEqual(includes.upward(self.read(), _HOST, ['first', 'last']),
                         ['host/first/A.cpp includes host/last/B.h'])
        self.assertEqual(includes.upward(self.read(), _HOST, ['last', 'first']), [])
        self.assertEqual(includes.upward(self.read(), _MODULE, ['first', 'last']), [])

    def test_include_of_a_header_without_a_folder_is_upward(self):
        self.write_host('B.h')
        self.write_host('last/A.cpp', 'B.h')
        self.assertEqual(includes.upward(self.read(), _HOST, ['first', 'last']),
                         ['host/last/A.cpp includes host/B.h'])

    def test_circle_of_headers(self):
        self.write_module('low/A.h', 'low/B.h')
        self.write_module('low/B.h', 'low/A.h')
        self.assertEqual(includes.circles(self.read()),
                         [f'{_MODULE}/low/A > {_MODULE}/low/B > {_MODULE}/low/A'])

    def test_circle_through_a_source_file(self):
        self.write_module('low/A.h')
        self.write_module('low/A.cpp', 'low/A.h', 'low/B.h')
        self.write_module('low/B.h', 'C.h')
        self.write_module('low/C.h')
        self.write_module('low/C.cpp', 'low/A.h')
        self.assertEqual(includes.circles(self.read()), [' > '.join(
            f'{_MODULE}/low/{name}' for name in 'ABCA')])

    def test_no_circle_of_a_file_and_its_own_header(self):
        self.write_module('low/A.h')
        self.write_module('low/A.cpp', 'low/A.h')
        self.assertEqual(includes.circles(self.read()), [])

    def test_module_that_includes_the_host_side(self):
        self.write_host('first/A.h')
        self.write_module('low/A.h', 'first/A.h')
        self.assertEqual(includes.strangers(self.read()),
                         [f'{_MODULE}/low/A.h includes host/first/A.h'])

    def test_host_side_that_includes_the_module(self):
        self.write_module('low/A.h')
        self.write_host('first/A.h', 'low/A.h')
        self.write_host('replay/A.h', 'low/A.h', 'first/A.h')
        self.assertEqual(includes.strangers(self.read()),
                         [f'host/first/A.h includes {_MODULE}/low/A.h'])

    def test_model_that_includes_the_module(self):
        self.write_module('low/A.h')
        self.write('tests/reference/Model.cpp', '#include "low/A.h"\n')
        self.assertEqual(includes.strangers(self.read()),
                         [f'tests/reference/Model.cpp includes {_MODULE}/low/A.h'])

    def test_header_that_is_not_there(self):
        self.write_module('low/A.h', 'Gone.h')
        self.assertEqual(includes.strangers(self.read()), [f'{_MODULE}/low/A.h includes Gone.h'])


class Braces(unittest.TestCase):
    """Of the tree."""

    def test_are_in_the_style_of_the_project(self):
        found = [f'{file}:{line}: {what}' for file, text in includes.read_sources(_ROOT).items()
                 for line, what in braces.findings(text)]
        self.assertEqual(found, [])


class PlantedBraces(unittest.TestCase):
    """Statements with right and with wrong braces."""

    def finds(self, text, *expected):
        self.assertEqual(braces.findings(text), list(expected))

    def test_around_a_single_statement(self):
        for head in ('if (a)', 'if constexpr (a)', 'for (;;)', 'while (a)'):
            self.finds(f'{head} {{\n    b(1,\n      2);\n}}',
                       (1, 'braces around a single statement'))
            self.finds(f'{head}\n    b(1,\n      2);')

    def test_around_both_branches(self):
        self.finds('x();\nif (a) {\n    b();\n} else if (c) {\n    d();\n} else {\n    e();\n}',
                   (2, 'braces around a single statement'))

    def test_around_a_lambda(self):
        self.finds('if (a) {\n    b([] { c(); d(); });\n}', (1, 'braces around a single statement'))

    def test_of_one_branch_alone(self):
        self.finds('if (a)\n    b();\nelse {\n    c();\n    d();\n}', (1, 'a body without braces'))
        self.finds('if (a) {\n    b();\n    c();\n} else {\n    d();\n}')

    def test_missing_around_a_control_statement(self):
        self.finds('for (;;)\n    if (a)\n        b();', (1, 'a body without braces'))
        self.finds('for (;;) {\n    if (a)\n        b();\n}')

    def test_around_a_comment_or_nothing(self):
        self.finds('if (a) {\n    // why\n    b();\n}')
        self.finds('while (a()) {\n}')

    def test_around_an_assertion_under_an_if(self):
        self.finds('if (a) {\n    EXPECT_EQ(b, c) << d;\n}')
        self.finds('for (;;)\n    EXPECT_EQ(b, c) << d;')

    def test_of_do_are_not_looked_at(self):
        self.finds('do {\n    a();\n} while (b);')

    def test_in_strings_are_not_seen(self):
        self.finds('a(R"x(if (a) {\n b();\n})x", "if (a) { b(); }");')


if __name__ == '__main__':
    unittest.main()
