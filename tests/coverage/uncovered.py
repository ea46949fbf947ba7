#!/usr/bin/env python3
"""Lines, branches and conditions (MC/DC) that no test covers, from what llvm-cov exports.

    uncovered.py --source DIR... (--exceptions FILE | --figures) [--only NAME]... EXPORT.json EXPORT.info

EXPORT.json and EXPORT.info are `llvm-cov export` of one build, the second with -format=lcov. Prints a
line of figures for each file and one for each place that is not covered. Ends with 1 when such a place
is not in the list of exceptions, or when an exception is covered after all. With --figures only the
figures, and nothing is judged.

A place that a template has several times counts as covered when one of them is; each of them must run.
"""
import argparse
import collections
import json
import pathlib
import sys

CONDITION = 6  # kind of a branch that is a condition of a decision

Place = collections.namedtuple("Place", "file line column what text")


class File:
    """What one source file has, merged over the instantiations of its templates."""

    def __init__(self, path, root):
        self.name = str(path.relative_to(root))
        self.source = path.read_text().split("\n")
        self.lines = {}  # number: executions
        self.branches = collections.defaultdict(lambda: [0, 0])  # span: times true, times false
        self.conditions = set()  # spans of branches that are conditions of a decision
        self.decisions = {}  # span: for each condition, whether it was seen to decide alone
        self.functions = {}  # (name, line): executions

    def text(self, span):
        first_line, first_column, last_line, last_column = span
        lines = self.source[first_line - 1:last_line]
        lines[-1] = lines[-1][:last_column - 1]
        lines[0] = lines[0][first_column - 1:]
        return " ".join(" ".join(lines).split())

    def place(self, span, what):
        return Place(self.name, span[0], span[1], what, self.text(span))

    def condition_spans(self, decision):
        inside = [s for s in self.conditions
                  if decision[:2] <= s[:2] and s[2:] <= decision[2:]]
        return sorted(inside)

    def uncovered(self):
        for number, count in sorted(self.lines.items()):
            if count == 0:
                yield Place(self.name, number, 1, "line", self.source[number - 1].strip())
        for span, (true, false) in sorted(self.branches.items()):
            if true == 0:
                yield self.place(span, "never true")
            if false == 0:
                yield self.place(span, "never false")
        for span, decided in sorted(self.decisions.items()):
            spans = self.condition_spans(span)
            for index, seen in enumerate(decided):
                if not seen:
                    named = spans[index] if len(spans) == len(decided) else span
                    yield self.place(named, "condition")
        for (name, line), count in sorted(self.functions.items()):
            if count == 0:
                yield Place(self.name, line, 1, "function", name)

    def figures(self):
        """(covered, all) of lines, branches and conditions."""
        sides = [side for counts in self.branches.values() for side in counts]
        decided = [seen for conditions in self.decisions.values() for seen in conditions]
        return [(sum(1 for x in values if x), len(values))
                for values in (list(self.lines.values()), sides, decided)]


def read_files(data, root, source, only):
    files = {}
    for entry in data["files"]:
        path = pathlib.Path(entry["filename"])
        if not any(path.is_relative_to(root / s) for s in source) or (only and path.name not in only):
            continue
        file = files[entry["filename"]] = File(path, root)
        for branch in entry["branches"]:
            span = tuple(branch[:4])
            file.branches[span][0] += branch[4]
            file.branches[span][1] += branch[5]
            if branch[8] == CONDITION:
                file.conditions.add(span)
        for record in entry["mcdc_records"]:
            span, seen = tuple(record[:4]), record[6]
            before = file.decisions.get(span, [False] * len(seen))
            file.decisions[span] = [a or b for a, b in zip(before, seen)]
    return files


def add_functions(data, files):
    for function in data["functions"]:
        file = files.get(function["filenames"][0])
        if file is not None:
            key = (function["name"], function["regions"][0][0])
            file.functions[key] = max(function["count"], file.functions.get(key, 0))


def add_lines(lcov, files):
    file = None
    for line in lcov.read_text().split("\n"):
        tag, _, value = line.partition(":")
        if tag == "SF":
            file = files.get(value)
        elif tag == "DA" and file is not None:
            number, count = value.split(",")[:2]
            file.lines[int(number)] = int(count)


def read_exceptions(path):
    """Lines `file | what | source text | why`."""
    exceptions = {}
    for number, line in enumerate(path.read_text().split("\n"), 1):
        if not line or line.startswith("#"):
            continue
        fields = [field.strip() for field in line.split(" | ")]
        if len(fields) != 4 or not all(fields):
            sys.exit(f"{path}:{number}: expected 'file | what | source text | why'")
        exceptions[tuple(fields[:3])] = False
    return exceptions


def share(covered, whole):
    return f"{covered:5} of {whole:5}" if whole else f"{'-':>14}"


def print_figures(files):
    sums = [[0, 0], [0, 0], [0, 0]]
    print(f"{'':42}{'lines':>14}{'branches':>16}{'conditions':>16}")
    for file in sorted(files, key=lambda f: f.name):
        figures = file.figures()
        for total, (covered, whole) in zip(sums, figures):
            total[0] += covered
            total[1] += whole
        print(f"{file.name:42}" + "  ".join(share(*f) for f in figures))
    print(f"{'all':42}" + "  ".join(share(*f) for f in sums))


def main():
    parser = argparse.ArgumentParser()
    parser.add_argument("--source", action="append", required=True)
    judged = parser.add_mutually_exclusive_group(required=True)
    judged.add_argument("--exceptions", type=pathlib.Path)
    judged.add_argument("--figures", action="store_true")
    parser.add_argument("--only", action="append", help="name of a file that counts, alone with others named so")
    parser.add_argument("json", type=pathlib.Path)
    parser.add_argument("lcov", type=pathlib.Path)
    options = parser.parse_args()
    root = pathlib.Path(__file__).resolve().parents[2]
    data = json.loads(options.json.read_text())["data"][0]
    files = read_files(data, root, options.source, options.only)
    add_functions(data, files)
    add_lines(options.lcov, files)
    if not files:
        sys.exit("no source file has figures")
    print_figures(files.values())
    if options.figures:
        return 0

    exceptions = read_exceptions(options.exceptions)
    failed = False
    for file in files.values():
        for place in file.uncovered():
            known = (place.file, place.what, place.text)
            listed = known in exceptions
            if listed:
                exceptions[known] = True
            failed = failed or not listed
            print(f"{'listed' if listed else 'NOT COVERED'}: {place.file}:{place.line}:{place.column}: "
                  f"{place.what}: {place.text}")
    for known, found in exceptions.items():
        if not found and not options.only:
            failed = True
            print(f"NO EXCEPTION ANY MORE: {' | '.join(known)}")
    return 1 if failed else 0


if __name__ == "__main__":
    sys.exit(main())
