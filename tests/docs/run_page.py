"""Runs the command blocks of a page one after another in one temporary directory.

usage: run_page.py PAGE ROOT COMMAND    (ROOT: the project's directory, COMMAND: the built fpnavi)
"""
import os
import pathlib
import sys
import tempfile

import blocks
import sample


def _environment(command, home):
    environment = dict(os.environ, HOME=str(home), NO_COLOR='1')
    environment['PATH'] = f'{command.parent}{os.pathsep}{os.environ["PATH"]}'
    return environment


def main(page, root, command):
    wrong = []
    with tempfile.TemporaryDirectory() as name:
        directory = pathlib.Path(name)
        environment = _environment(command, directory)
        sample.make(directory, environment)
        found = blocks.commands(page.read_text(encoding='utf-8'))
        for block in found:
            missing = blocks.missing_scripts(block, root)
            if missing:
                wrong.append(f'line {block.line}: there is no {", ".join(missing)}')
            elif 'not run' not in block.marks:
                wrong += filter(None, [blocks.run(block, directory, environment)])
    print('\n'.join(f'{page}: {text}' for text in wrong) or f'{page}: {len(found)} blocks, fine')
    return 1 if wrong else 0


if __name__ == '__main__':
    sys.exit(main(*(pathlib.Path(word) for word in sys.argv[1:])))
