"""Mutation testing of the module: see docs/mutation.md. Started by scripts/mutate."""
import argparse
import hashlib
import pathlib
import queue
import sys
import time

from mutants import mutants_of
from results import Reasons, Result, Results, digest, report
from stages import Plan
from tree import Failure, Tree
from worker import SURVIVED, Worker

_HERE = pathlib.Path(__file__).resolve().parent
_ROOT = _HERE.parent.parent


def _options():
    parser = argparse.ArgumentParser(prog='scripts/mutate', description=(
        'Changes the module in small ways, one at a time, and runs the tests on each change.'))
    parser.add_argument('files', nargs='*', metavar='FILE', help='only these source files')
    parser.add_argument('--sample', type=int, default=1000, metavar='N',
                        help='so many mutants, drawn by the seed (default 1000)')
    parser.add_argument('--seed', type=int, default=1, metavar='S', help='default 1')
    parser.add_argument('--all', action='store_true', help='all mutants')
    parser.add_argument('--survivors', action='store_true',
                        help='only those again that no test has killed')
    parser.add_argument('--only', default='', metavar='WORD',
                        help='with --survivors: only stages with this word in their name')
    parser.add_argument('--report', action='store_true', help='only tell what is known')
    parser.add_argument('-j', type=int, default=2, dest='jobs', metavar='N',
                        help='so many at a time (default 2)')
    parser.add_argument('--work', type=pathlib.Path, default=_ROOT / 'build/mutation',
                        metavar='DIR', help='default build/mutation')
    options = parser.parse_args()
    if options.only and not options.survivors:
        parser.error('--only is for --survivors: what other stages kill would count as survived')
    return options


def _generate(folder, sources):
    """All mutants of the sources, and for each file which version of it they are of."""
    mutants, digests = [], {}
    for file in sources:
        text = (folder / file).read_text()
        digests[file] = digest(text)
        mutants += mutants_of(file, text)
    return mutants, digests


def _chosen(mutants, options):
    """The mutants to try, in an order that a larger sample goes on with."""
    wanted = [m for m in mutants if not options.files or any(
        m.file == f or m.file.endswith(f'/{f}') for f in options.files)]
    if not wanted:
        raise Failure('no mutants in ' + ' '.join(options.files))
    wanted.sort(key=lambda m: hashlib.sha1(f'{options.seed} {m.key}'.encode()).digest())
    return wanted if options.all else wanted[:options.sample]


def _is_due(result, options):
    """Whether a mutant with this result, None if it has none, is to be tried."""
    if options.survivors:
        return result is not None and result.verdict == SURVIVED
    return result is None


def _try(tree, mutants, results, options):
    """Runs the workers until all mutants have a result."""
    plan = Plan(tree, options.work, options.only)
    for stage in plan.stages:
        print(f'{stage.seconds:6.2f} s  {stage.name} {stage.filter}')
    sys.stdout.flush()
    waiting = queue.SimpleQueue()
    for mutant in mutants:
        waiting.put(mutant)
    workers = [Worker(tree, plan, options.work / f'w{n}', waiting,
                      lambda mutant, *result: results.add(mutant, Result(*result)))
               for n in range(options.jobs)]
    start = time.monotonic()
    for worker in workers:
        worker.start()
    for worker in workers:
        while worker.is_alive():
            worker.join(5)
            if sys.stderr.isatty():
                done = len(mutants) - waiting.qsize()
                print(f'\r{done} of {len(mutants)}', end='', file=sys.stderr)
        if worker.error:
            raise worker.error
    print(f'{len(mutants)} mutants in {time.monotonic() - start:.0f} s')


def main():
    """Returns the exit code: 0 when every survivor has its reason, 1 if not, 2 for an error."""
    options = _options()
    options.work = options.work.resolve()
    options.work.mkdir(parents=True, exist_ok=True)
    try:
        tree = Tree(_ROOT, options.work, options.jobs)
        mutants, digests = _generate(tree.copy, tree.sources())
        results = Results(options.work / 'results.tsv', digests)
        chosen = _chosen(mutants, options)
        waiting = [m for m in chosen if _is_due(results.of(m), options)]
        if waiting and not options.report:
            _try(tree, waiting, results, options)
        well = report(mutants, chosen, results, Reasons(_HERE / 'survivors.txt'))
    except Failure as failure:
        print(f'FAILED: {failure}', file=sys.stderr)
        return 2
    return 0 if well else 1


if __name__ == '__main__':
    sys.exit(main())
