"""The code blocks of a page, and how a test runs those that hold commands.

A command block has the language sh or python. Comments on the lines directly above it say how it is
run:

    <!-- not run: REASON -->          not at all; the scripts that it names have to exist
    <!-- may end with 1: REASON -->   a command of it may find something wrong
"""
import re
import subprocess
from dataclasses import dataclass, field

_FENCE = re.compile(r'^ *```(\w*) *$')
_COMMENT = re.compile(r'^ *<!-- (not run|may end with 1): (.+) -->$')
_LOOKS_LIKE_COMMANDS = re.compile(r'^ *(fpnavi [a-z]|cmake |ctest |scripts/|build/)')
_SCRIPT = re.compile(r'\bscripts/[\w.-]+')
_COMMANDS = {'sh', 'python'}


@dataclass
class Block:
    line: int  # of its first line of text
    language: str
    text: str
    marks: dict = field(default_factory=dict)  # 'not run' or 'may end with 1' to the reason


def _marks_above(lines, fence):
    marks = {}
    while fence > 0 and (found := _COMMENT.match(lines[fence - 1])):
        marks[found[1]] = found[2]
        fence -= 1
    return marks


def blocks(text):
    """All fenced blocks of a page, in their order."""
    lines = text.split('\n')
    found = []
    start = None
    for number, line in enumerate(lines):
        fence = _FENCE.match(line)
        if not fence:
            continue
        if start is None:
            start, language = number, fence[1]
        else:
            found.append(Block(start + 2, language, '\n'.join(lines[start + 1:number]) + '\n',
                               _marks_above(lines, start)))
            start = None
    if start is not None:
        raise ValueError(f'line {start + 1}: a block without an end')
    return found


def commands(text):
    """The command blocks of a page. ValueError for a block of commands without a language."""
    found = blocks(text)
    for block in found:
        if not block.language and _LOOKS_LIKE_COMMANDS.match(block.text):
            raise ValueError(f'line {block.line}: commands in a block without the language sh')
    return [block for block in found if block.language in _COMMANDS]


def missing_scripts(block, root):
    return [name for name in _SCRIPT.findall(block.text) if not (root / name).exists()]


def run(block, directory, environment):
    """Runs a block in the directory. Returns what is wrong with it; nothing when it is fine."""
    if block.language == 'python':
        words = ['python3', '-c', block.text]
    else:
        # Ends at the first command that fails. A code of 1 may be a finding.
        worst = 1 if 'may end with 1' in block.marks else 0
        trap = f'trap \'code=$?; [ $code -le {worst} ] || exit $code\' ERR\n'
        words = ['bash', '-c', trap + block.text + 'true\n']
    done = subprocess.run(words, cwd=directory, env=environment, stdin=subprocess.DEVNULL,
                          capture_output=True, text=True, errors='replace', check=False)
    if done.returncode == 0:
        return ''
    return f'line {block.line}: exit code {done.returncode}\n{block.text}{done.stdout}{done.stderr}'
