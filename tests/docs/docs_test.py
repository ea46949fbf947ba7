"""What blocks.py takes for a command block, and that it sees one that fails; pages against the module."""
import os
import pathlib
import re
import tempfile
import unittest

import blocks

_ROOT = pathlib.Path(__file__).parents[2]
_MODULE = _ROOT / 'fpsvc/callib/FpNavi'


def _run(text):
    with tempfile.TemporaryDirectory() as directory:
        return [blocks.run(block, directory, dict(os.environ)) for block in blocks.commands(text)]


class Blocks(unittest.TestCase):
    def test_only_command_languages(self):
        text = '```sh\na\n```\n```c\nb\n```\n```\nc\n```\n```python\nd\n```\n'
        self.assertEqual([(b.line, b.text) for b in blocks.commands(text)], [(2, 'a\n'), (11, 'd\n')])

    def test_commands_without_a_language_are_an_error(self):
        for command in ['fpnavi params', 'scripts/test', 'cmake --preset dev']:
            with self.assertRaisesRegex(ValueError, 'line 2'):
                blocks.commands(f'```\n{command}\n```\n')
        blocks.commands('```\nfpnavi: corpus.db: gesture\n```\n')  # a message

    def test_block_without_an_end_is_an_error(self):
        with self.assertRaisesRegex(ValueError, 'line 1'):
            blocks.blocks('```sh\na\n')

    def test_marks_stand_directly_above(self):
        marked = '<!-- not run: slow -->\n<!-- may end with 1: so it is -->\n```sh\na\n```\n'
        self.assertEqual(blocks.commands(marked)[0].marks,
                         {'not run': 'slow', 'may end with 1': 'so it is'})
        self.assertEqual(blocks.commands('<!-- not run: slow -->\n\n```sh\na\n```\n')[0].marks, {})
        self.assertEqual(blocks.commands('<!-- not run: -->\n```sh\na\n```\n')[0].marks, {})

    def test_any_failing_command_is_seen(self):
        self.assertEqual(_run('```sh\ntrue\n```\n'), [''])
        self.assertIn('exit code 1', _run('```sh\nfalse\ntrue\n```\n')[0])
        self.assertIn('exit code 127', _run('```sh\nno-such-command-here\ntrue\n```\n')[0])
        self.assertIn('exit code 1', _run('```python\nraise ValueError\n```\n')[0])

    def test_a_code_of_1_may_be_allowed_and_no_other(self):
        mark = '<!-- may end with 1: a finding -->\n'
        self.assertEqual(_run(mark + '```sh\nfalse\ntrue\n```\n'), [''])
        self.assertIn('exit code 3', _run(mark + '```sh\n(exit 3)\ntrue\n```\n')[0])

    def test_missing_scripts(self):
        block = blocks.commands('```sh\nscripts/demo; scripts/dance\n```\n')[0]
        self.assertEqual(blocks.missing_scripts(block, _ROOT), ['scripts/dance'])


class Parameters(unittest.TestCase):
    def test_never_read_are_those_that_no_source_names(self):
        names = re.findall(r'^NAVI_(?:PARAM|BAND)\((\w+),',
                           (_MODULE / 'param/NaviParamList.h').read_text(), re.MULTILINE)
        text = ''.join(path.read_text() for path in _MODULE.glob('*/*')
                       if path.suffix in ('.h', '.cpp') and path.name != 'NaviParamList.h')
        code = re.sub(r'//.*|/\*.*?\*/', '', text)
        unread = {name for name in names if not re.search(rf'\b{name}\b', code)}
        page = (_ROOT / 'docs/parameters.md').read_text(encoding='utf-8')
        told = {name.split('.')[0] for name in
                re.findall(r'^\| \d+ \| `([\w.]+)` \| \S+ \| stored, never read \|', page, re.MULTILINE)}
        self.assertEqual(unread, told)
        self.assertEqual(len(names), 73)  # 68 numbers and 5 bands of two


if __name__ == '__main__':
    unittest.main()
