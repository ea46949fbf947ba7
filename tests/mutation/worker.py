"""One mutant at a time, in a directory of the worker's own: compiled, compared, linked, tested."""
import queue
import subprocess
import threading

from tree import SANITIZE, copy_changed

KILLED, SURVIVED, BROKEN, SAME = 'killed', 'survived', 'not compiling', 'same code'
_FOLDERS = ('fpsvc', 'devhal')  # all that a mutated file is compiled with, but for the tests


class _NotBuilt(Exception):
    """The mutant does not compile or link."""


class Worker(threading.Thread):
    """Takes mutants until there are none, and hands each verdict to done(mutant, ...)."""

    def __init__(self, tree, plan, work, mutants, done):
        """mutants: a queue.SimpleQueue, shared with the other workers."""
        super().__init__(daemon=True)
        self.tree, self.plan, self.mutants, self.done = tree, plan, mutants, done
        self.work = work
        self.error = None
        for folder in _FOLDERS:
            copy_changed(tree.copy / folder, work / 'tree' / folder)

    def run(self):
        try:
            while True:
                mutant = self.mutants.get_nowait()
                self.done(mutant, *self.judge(mutant))
        except queue.Empty:
            pass
        except Exception as error:  # for the main thread to raise
            self.error = error

    def judge(self, mutant):
        """Returns (verdict, stage that killed it, why)."""
        try:
            changed = self._compile(mutant, self.tree.objects_with(mutant.file))
            if not changed:
                return SAME, '', ''
            return self._test(mutant, self.plan.for_file(mutant.file), changed)
        except _NotBuilt:
            return BROKEN, '', ''

    def _test(self, mutant, stages, changed):
        programs, sanitized = {}, None
        for stage in stages:
            key = stage.target, stage.sanitized
            if stage.sanitized and sanitized is None:
                inside = [name for name in changed if self.tree.is_sanitized(name)]
                sanitized = self._compile(mutant, inside, SANITIZE)
            if key not in programs:
                programs[key] = self.work / f'{stage.target}{"_sanitized" * stage.sanitized}'
                self._build(self.tree.sanitized_link_command(stage.target, programs[key], sanitized)
                            if stage.sanitized
                            else self.tree.link_command(stage.target, programs[key], changed))
            passed, why = stage.run(programs[key], self.work / 'test.log')
            if not passed:
                return KILLED, stage.name, why
        return SURVIVED, '', ''

    def _compile(self, mutant, objects, flags=()):
        """Objects that differ from the original's, as {name: new file}."""
        place = self.work / 'tree' / mutant.file
        original = (self.tree.copy / mutant.file).read_text()
        place.write_text(mutant.apply(original))
        changed = {}
        try:
            for name in objects:
                new = self.work / ('sanitized' if flags else 'obj') / name
                new.parent.mkdir(parents=True, exist_ok=True)
                command = [*map(self._mine, self.tree.compile[name]), *flags]
                command[command.index('-o') + 1] = str(new)
                self._build(command)
                old = self.tree.sanitized(name) if flags else self.tree.build / name
                if new.read_bytes() != old.read_bytes():
                    changed[name] = new
        finally:
            place.write_text(original)
        return changed

    def _mine(self, argument):
        """A path in the worker's copy instead of the tree's."""
        for folder in _FOLDERS:
            argument = argument.replace(f'{self.tree.copy}/{folder}/', f'{self.work}/tree/{folder}/')
        return argument

    def _build(self, command):
        if subprocess.run(command, cwd=self.tree.build, check=False, stdin=subprocess.DEVNULL,
                          stdout=subprocess.DEVNULL, stderr=subprocess.DEVNULL).returncode != 0:
            raise _NotBuilt
