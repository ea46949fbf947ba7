"""What became of the mutants: a file that grows line by line, and the reasons for survivors."""
import hashlib
import threading
from collections import Counter
from dataclasses import dataclass

from mutants import squeezed
from tree import Failure
from worker import BROKEN, KILLED, SAME, SURVIVED

_COLUMNS = ('key', 'text', 'file', 'line', 'operator', 'change', 'verdict', 'stage', 'why')
WANTED_SHARE = 95  # percent


@dataclass(frozen=True)
class Result:
    """The verdict on one mutant. stage and why: which tests killed it, and how."""
    verdict: str
    stage: str
    why: str


def digest(text):
    """Says which version of a file a verdict is about."""
    return hashlib.sha1(text.encode()).hexdigest()[:12]


class Results:
    """The file of results. A later line for the same mutant replaces an earlier one."""

    def __init__(self, path, digests):
        self._path, self._digests, self._lock = path, digests, threading.Lock()
        self._known = {}
        if path.exists():
            for line in path.read_text().splitlines()[1:]:
                row = dict(zip(_COLUMNS, line.split('\t')))
                if len(row) == len(_COLUMNS):
                    self._known[row['key'], row['text']] = Result(row['verdict'], row['stage'],
                                                                  row['why'])
        else:
            path.write_text('\t'.join(_COLUMNS) + '\n')

    def of(self, mutant):
        """The result for a mutant of the file as it is now, or None."""
        return self._known.get((mutant.key, self._digests[mutant.file]))

    def add(self, mutant, result):
        """Keeps a result, in the file at once."""
        text = self._digests[mutant.file]
        row = (mutant.key, text, mutant.file, str(mutant.line), mutant.operator, mutant.change(),
               result.verdict, result.stage, result.why)
        with self._lock:
            self._known[mutant.key, text] = result
            with open(self._path, 'a', encoding='utf-8') as file:
                file.write('\t'.join(squeezed(cell) for cell in row) + '\n')


class Reasons:
    """Why a mutant is no mistake. Paragraphs of 'file:', 'line:', one or more 'change:', 'reason:'.

    line is the text of the source line, so that a reason outlives lines added above it; of lines
    with one text the second is 'line 2:', and so on."""

    def __init__(self, path):
        self._reasons = {}
        paragraphs = path.read_text().split('\n\n') if path.exists() else []
        for paragraph in paragraphs:
            lines = [l for l in paragraph.splitlines() if l.strip() and not l.startswith('#')]
            if lines:
                self._read(lines, path)

    def _read(self, lines, path):
        fields = {'file': [], 'line': [], 'change': [], 'reason': []}
        name = None
        for line in lines:
            head, colon, rest = line.partition(':')
            head, _, nth = head.partition(' ')
            if not line[0].isspace() and colon and head in fields:
                name = head
                text = rest.strip()
                fields[name].append((text, int(nth or 1)) if name == 'line' else text)
            elif name == 'reason' and line[0].isspace():
                fields[name][-1] += ' ' + line.strip()
            else:
                raise Failure(f'{path}: not understood: {line}')
        if not all(fields.values()):
            raise Failure(f'{path}: file, line, change and reason are needed: {lines[0]}')
        for file in fields['file']:
            for source in fields['line']:
                for change in fields['change']:
                    self._reasons[file, *source, change] = ' '.join(fields['reason'])

    @classmethod
    def _key(cls, mutant):
        return mutant.file, mutant.source, mutant.nth, cls.change(mutant)

    @staticmethod
    def change(mutant):
        """A mutant's change as the file names it, with its column within the line."""
        return f'{mutant.column} {mutant.operator}: {mutant.change()}'

    def unknown(self, mutants):
        """The reasons for changes that are none of the mutants: of lines that are gone."""
        known = {self._key(m) for m in mutants}
        return [' | '.join(map(str, key)) for key in self._reasons if key not in known]

    def of(self, mutant):
        """The reason for a mutant, or None."""
        return self._reasons.get(self._key(mutant))


def _share(killed, survived):
    return 100 * killed / (killed + survived) if killed + survived else 100.0


def _contradictions(all_mutants, found, reasons):
    """Prints the reasons that cannot be true. Returns their number."""
    unknown = reasons.unknown(all_mutants)
    killed = [m for m, r in found.items() if r and r.verdict == KILLED and reasons.of(m)]
    for text in unknown:
        print(f'a reason for what is no mutant: {text}')
    for mutant in killed:
        print(f'said to change nothing, but killed by {found[mutant].why}: {mutant.file}:'
              f'{mutant.line}: {Reasons.change(mutant)}')
    return len(unknown) + len(killed)


def report(all_mutants, tried, results, reasons):
    """Prints the figures and the survivors. Returns whether all is well."""
    found = {mutant: results.of(mutant) for mutant in tried}
    verdicts = Counter(r.verdict for r in found.values() if r)
    stages = Counter(r.stage for r in found.values() if r and r.verdict == KILLED)
    survivors = sorted((m for m, r in found.items() if r and r.verdict == SURVIVED),
                       key=lambda m: (m.file, m.line, m.start, m.after))
    for mutant in survivors:
        print(f'{mutant.file}:{mutant.line}')
        print(f'    line{f" {mutant.nth}" if mutant.nth > 1 else ""}: {mutant.source}')
        print(f'    change: {Reasons.change(mutant)}')
        print(f'    reason: {reasons.of(mutant) or "NONE"}')
    contradictions = _contradictions(all_mutants, found, reasons)
    unexplained = sum(reasons.of(m) is None for m in survivors)
    killed, survived = verdicts[KILLED], verdicts[SURVIVED]
    print(f'\n{len(all_mutants)} mutants in all, {sum(verdicts.values())} of {len(tried)} tried: '
          f'{verdicts[BROKEN]} not compiling, {verdicts[SAME]} same code, {killed} killed, '
          f'{survived} survived')
    for stage, count in stages.most_common():
        print(f'  killed by {stage}: {count}')
    without = _share(killed, unexplained)
    print(f'killed share: {_share(killed, survived):.1f} % of all, {without:.1f} % without the '
          f'{survived - unexplained} survivors that are shown to change nothing')
    complete = sum(verdicts.values()) == len(tried)
    return complete and unexplained + contradictions == 0 and without >= WANTED_SHARE
