"""The sources as they were at the start, and the tests built from them.

Everything happens in a copy below the work directory, so that the tree itself is never touched and
may be edited meanwhile.
"""
import concurrent.futures
import filecmp
import json
import os
import pathlib
import re
import shlex
import shutil
import subprocess

MUTATED = ('fpsvc/callib/FpNavi', 'fpsvc/callib/FingerDetect', 'devhal/alog')
TARGETS = ('unit_tests', 'finger_detect_tests', 'finger_detect_tests_plain_lanes', 'step_tests',
           'step_tests_plain_lanes', 'compare_tests', 'reliability_tests', 'golden_tests')
PLAIN = ('NaviSimd.h', 'WordLanes.h')  # have plain loops for other processors
_PLAIN_OBJECTS = ('fpnavi_module_plain_lanes.dir', 'fpnavi_finger_detect_plain_lanes.dir')
SANITIZE = ('-fsanitize=address,undefined', '-fno-sanitize-recover=all')
_LEFT_OUT = {'build', 'web', 'demo', '.git', 'node_modules', '__pycache__'}


class Failure(Exception):
    """Something that is wrong before any mutant runs; its text is for the user."""


def run(command, **options):
    """Runs a command and returns its output; Failure with its last lines when it fails."""
    done = subprocess.run(command, stdout=subprocess.PIPE, stderr=subprocess.STDOUT, text=True,
                          check=False, **options)
    if done.returncode != 0:
        tail = '\n'.join(done.stdout.splitlines()[-30:])
        raise Failure(f'{shlex.join(map(str, command))}\n{tail}')
    return done.stdout


def copy_changed(source, target):
    """Makes target equal to source; files that are equal keep their time."""
    for folder, folders, files in os.walk(source):
        folders[:] = [f for f in folders if f not in _LEFT_OUT and not f.startswith('build-')]
        there = pathlib.Path(target, os.path.relpath(folder, source))
        there.mkdir(parents=True, exist_ok=True)
        for gone in there.iterdir():
            if gone.name not in files and gone.name not in folders:
                shutil.rmtree(gone) if gone.is_dir() else gone.unlink()
        for name in files:
            old, new = pathlib.Path(folder, name), there / name
            if not new.exists() or not filecmp.cmp(old, new, shallow=False):
                shutil.copy(old, new)


class Tree:
    """The copy, its build directory, and the commands that made its objects and programs."""

    def __init__(self, root, work, jobs):
        self.copy, self.build = work / 'tree', work / 'base'
        copy_changed(root, self.copy)
        flags = '-w -fuse-ld=lld' if shutil.which('ld.lld') else '-w'
        run(['cmake', '-S', self.copy, '-B', self.build, '-G', 'Ninja', '-DCMAKE_C_COMPILER=gcc',
             '-DCMAKE_CXX_COMPILER=g++', '-DCMAKE_BUILD_TYPE=RelWithDebInfo',
             f'-DCMAKE_CXX_FLAGS={flags}', '-DCMAKE_CXX_FLAGS_RELWITHDEBINFO=-O2 -DNDEBUG'])
        run(['cmake', '--build', self.build, f'-j{jobs}', '--target', *TARGETS])
        self._read_commands()
        self._sanitize(jobs)

    def _sanitize(self, jobs):
        """The module's objects once more, with the sanitizers: below build/sanitized."""
        with concurrent.futures.ThreadPoolExecutor(jobs) as pool:
            list(pool.map(self._sanitize_one, filter(self.is_sanitized, self.compile)))

    def _sanitize_one(self, name):
        old, new = self.build / name, self.sanitized(name)
        if new.exists() and new.stat().st_mtime > old.stat().st_mtime:
            return
        new.parent.mkdir(parents=True, exist_ok=True)
        command = [*self.compile[name], *SANITIZE]
        command[command.index('-o') + 1] = str(new)
        run(command, cwd=self.build)

    def sanitized(self, name):
        """The object of a module's file compiled with the sanitizers."""
        return self.build / 'sanitized' / name

    @staticmethod
    def in_module(name):
        """The object is one that a device gets."""
        return name.startswith(MUTATED)

    @staticmethod
    def is_plain(name):
        """The object is one of the module with the plain loops."""
        return any(folder in name for folder in _PLAIN_OBJECTS)

    @classmethod
    def is_sanitized(cls, name):
        """The object has a twin with the sanitizers."""
        return cls.in_module(name) or cls.is_plain(name)

    def _read_commands(self):
        entries = json.loads((self.build / 'compile_commands.json').read_text())
        commands = [shlex.split(entry['command']) for entry in entries]
        self.compile = {command[command.index('-o') + 1]: command for command in commands}
        self.link = {target: self._link_command(target) for target in TARGETS}
        self.depends = {}
        for block in run(['ninja', '-C', self.build, '-t', 'deps']).split('\n\n'):
            name, _, files = block.partition(': #deps')
            if name.endswith('.o'):
                self.depends[name] = set(self._own(files.split('\n')[1:]))

    def _own(self, lines):
        """The dependencies that belong to the tree, relative to it."""
        for line in lines:
            path = os.path.normpath(os.path.join(self.build, line.strip()))
            if path.startswith(f'{self.copy}/'):
                yield os.path.relpath(path, self.copy)

    def _link_command(self, target):
        last = run(['ninja', '-C', self.build, '-t', 'commands', target]).splitlines()[-1]
        command = next(c for c in last.split(' && ') if re.match(r'\S*g\+\+ ', c))
        return shlex.split(command)

    def program(self, target):
        """Path of a target's program, without changes."""
        command = self.link[target]
        return self.build / command[command.index('-o') + 1]

    def link_command(self, target, program, changed, flags=()):
        """Links program like target, with the objects of changed, {name: new file}.

        The module's come first, so that their inline functions are the ones that count, and that
        they are taken instead of an archive's; those of the tests keep their order."""
        linked = {n: str(f) for n, f in changed.items() if self._links(target, n)}
        first = {n for n in linked if '/unit_tests.dir/' not in n}
        command = [linked.get(a, a) for a in self.link[target] if a not in first]
        at = command.index('-o')
        command[at:at + 2] = [*flags, *(linked[n] for n in sorted(first)), '-o', str(program)]
        return command

    def _links(self, target, name):
        """The target's program has the object, by itself or in an archive."""
        folder, _, rest = name.partition('/CMakeFiles/')
        library = rest.partition('.dir/')[0]
        archive = 'host/libfpnavi_host.a' if folder == MUTATED[0] else f'{folder}/lib{library}.a'
        return name in self.link[target] or archive in self.link[target]

    def sanitized_link_command(self, target, program, changed):
        """Links program like target, with the module sanitized; changed are objects of it."""
        twins = filter(self.is_sanitized, self.compile)
        module = {name: changed.get(name, self.sanitized(name)) for name in twins}
        return self.link_command(target, program, module, SANITIZE)

    def sources(self):
        """The files that are mutated, relative to the tree."""
        return sorted(str(path.relative_to(self.copy)) for folder in MUTATED
                      for path in (self.copy / folder).rglob('*') if path.suffix in ('.h', '.cpp'))

    def objects_with(self, file):
        """Objects that a change of file may change: the module's, and of the tests of that name.

        Tests take the inline functions of a header into their own objects."""
        stem, plain_lanes = pathlib.Path(file).stem, file.endswith(PLAIN)
        for name, files in self.depends.items():
            test = f'unit_tests.dir/{stem}Test.cpp.o' in name and file.endswith('.h')
            plain = plain_lanes and self.is_plain(name)
            if file in files and (test or plain or self.in_module(name)):
                yield name
