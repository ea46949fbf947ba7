"""The tests in the order in which they look at a mutant: those that are near and quick first."""
import math
import os
import pathlib
import re
import resource
import subprocess
from dataclasses import dataclass, field, replace

from tree import PLAIN, Failure, run

# Files of the module whose tests are in the test file of another.
_TESTED_IN = {
    'BiThreshold': 'PreProcess', 'FingerRidge': 'PreProcess',
    'FramePair': 'FingerNoMove', 'Templates': 'FindCandidate',
    'PlacementScores': 'FindCandidate', 'CandidateSearch': 'FindCandidate',
    'DisplacementScore': 'ImgJoint', 'PairMatch': 'ImgJoint', 'TuneMeasure': 'Tune',
    'TuneRegisters': 'Tune', 'WordLanes': 'FingerDetect', 'VoteInfoLog': 'Voting',
    'alog_host': 'Log', 'NaviLog': 'Log', 'NaviParamList': 'BeforeSetNaviParam',
}
# Files that the step tests do not call.
_NO_STEPS = {'Voting', 'VotingFp', 'VotingHg', 'VoteInfoLog', 'Tune', 'TuneMeasure',
             'TuneRegisters', 'alog_host'}
_COMPARED = {'FPNAVI_COMPARE_GESTURES': '200', 'FPNAVI_HOSTILE_BLOCKS': '60'}
_MEMORY = 1 << 30  # bytes a test may take; the largest takes a tenth
_OUTPUT = 1 << 24  # bytes it may print
_SLOWER = 3        # a test that takes that many times its usual processor time hangs


@dataclass
class Stage:
    """One run of a test program. seconds: processor time when all is well."""
    name: str
    target: str
    filter: str = '*'
    env: dict = field(default_factory=dict)
    sanitized: bool = False
    seconds: float = 0.0

    def run(self, program, log):
        """Runs it. Returns (passed, the first failed test or how else it ended)."""
        limit = math.ceil(self.seconds * _SLOWER) + 1
        env = {**os.environ, 'RC_PARAMS': 'seed=20240117', 'GTEST_FAIL_FAST': '1', **self.env}
        limits = [f'--cpu={limit}:{limit + 1}', f'--fsize={_OUTPUT}', '--core=0']
        if not self.sanitized:  # the address sanitizer reserves terabytes
            limits.append(f'--as={_MEMORY}')
        with open(log, 'wb') as output:
            try:
                code = subprocess.run(['prlimit', *limits, program, f'--gtest_filter={self.filter}'],
                                      stdout=output, stderr=subprocess.STDOUT, env=env,
                                      stdin=subprocess.DEVNULL, cwd=pathlib.Path(log).parent,
                                      timeout=limit * 20, check=False).returncode
            except subprocess.TimeoutExpired:
                return False, 'time'
        return code == 0, '' if code == 0 else _why(code, log)


def _why(code, log):
    """The test that failed first, or the signal."""
    with open(log, 'rb') as output:
        text = output.read().decode(errors='replace')
    failed = re.search(r'^\[  FAILED  \] ([\w./]+)', text, re.MULTILINE)
    if failed:
        return failed.group(1)
    report = re.search(r'(AddressSanitizer|LeakSanitizer|runtime error): .{0,60}', text)
    if report:
        return report.group()
    return 'time' if code == -24 else f'signal {-code}' if code < 0 else f'exit {code}'


def _suites(tree, stem):
    """gtest filter for the suites in the test files of a step; empty without any."""
    suites = set()
    for name in (stem, _TESTED_IN.get(stem, stem)):
        for path in (tree.copy / 'tests/unit').glob(f'{name}*Test.cpp'):
            suites.update(re.findall(r'^(?:TEST|TEST_F|TEST_P|RC_GTEST_PROP|RC_GTEST_FIXTURE_PROP)'
                                     r'\(\s*(\w+)', path.read_text(), re.MULTILINE))
    return ':'.join(f'{s}.*:*/{s}.*' for s in sorted(suites))


def _timed(tree, work, stage):
    """The stage's time when nothing is changed. Failure when it does not pass."""
    program, log = tree.program(stage.target), work / f'{stage.name}.log'.replace(' ', '-')
    if stage.sanitized:
        program = program.with_name(f'{program.name}_sanitized')
        run(tree.sanitized_link_command(stage.target, program, {}), cwd=tree.build)
    stage.seconds = 100
    before = resource.getrusage(resource.RUSAGE_CHILDREN)
    passed, why = stage.run(program, log)
    after = resource.getrusage(resource.RUSAGE_CHILDREN)
    if not passed:
        raise Failure(f'{stage.name} fail without any change: {why}, see {log}')
    stage.seconds = after.ru_utime + after.ru_stime - before.ru_utime - before.ru_stime
    return log.read_text()


class Plan:
    """All stages in their order, with the time that each takes when nothing is changed."""

    def __init__(self, tree, work, only=''):
        """only: a word that the names of the wanted stages have."""
        self._tree = tree
        unit = Stage('unit tests', 'unit_tests')
        alone = re.findall(r'^\[  SKIPPED \] (\S+) \(', _timed(tree, work, unit), re.MULTILINE)
        wanted = [
            Stage('own unit tests', 'unit_tests', seconds=unit.seconds),
            Stage('texture unit tests', 'finger_detect_tests'),
            Stage('texture plain lanes', 'finger_detect_tests_plain_lanes'), unit,
            *(Stage('unit tests alone', 'unit_tests', name) for name in alone),
            Stage('step by step', 'step_tests', env=_COMPARED),
            Stage('plain lanes', 'step_tests_plain_lanes', env=_COMPARED),
            Stage('whole gestures', 'compare_tests', env=_COMPARED),
            Stage('kept records', 'golden_tests'),
            Stage('failing allocations', 'reliability_tests', '-BoundaryValues.*', _COMPARED),
            Stage('sanitized unit tests', 'unit_tests', sanitized=True),
            Stage('sanitized texture unit tests', 'finger_detect_tests', sanitized=True),
            Stage('sanitized texture plain lanes', 'finger_detect_tests_plain_lanes',
                  sanitized=True),
            Stage('sanitized steps', 'step_tests', env=_COMPARED, sanitized=True),
            Stage('sanitized plain lanes', 'step_tests_plain_lanes', env=_COMPARED,
                  sanitized=True),
        ]
        self.stages = [stage for stage in wanted if only in stage.name]
        for stage in self.stages:
            if not stage.seconds:
                _timed(tree, work, stage)

    def for_file(self, file):
        """The stages that look at a mutant of file, in their order."""
        stages = [s for s in self.stages
                  if file.endswith(PLAIN) or not s.target.endswith('_plain_lanes')]
        if 'FingerDetect' in file:
            return [s for s in stages if s.target.startswith(('finger_detect', 'golden'))]
        stem = pathlib.Path(file).stem
        own = _suites(self._tree, stem)
        stages = [s for s in stages if not s.target.startswith('finger_detect')]
        if stem in _NO_STEPS:
            stages = [s for s in stages if s.target != 'step_tests']
        return [replace(s, filter=own) if s.name == 'own unit tests' else s for s in stages
                if own or s.name != 'own unit tests']
