#!/usr/bin/env python3
"""Runs the library's tests of a build with SENSELOOM_COVERAGE, and fails unless they run all of src/: every piece of
code, and every condition both ways. Code counts as run when it is in any test program, and a template when it is in any
instance.

  coverage.py BUILD_FOLDER

A line with a comment "not covered: REASON" is let off. One that is covered all the same is reported, too.
"""

import collections
import json
import os
import pathlib
import re
import subprocess
import sys

SOURCES = pathlib.Path(__file__).resolve().parent.parent / "src"
LET_OFF = re.compile(r"// .*\bnot covered: \S")
CODE = 0  # kind of a region, of clang's

# Tests of the library. Those of the tool record it, among other things: the counters of two libraries of the same name
# would not go together in one process.
FOLDERS = ["tests/unit", "tests/api", "tests/model", "fuzz"]


def run_tests(build):
    """Runs the tests; returns what clang tells of the code that ran."""
    profiles = build / "profiles"
    for old in profiles.glob("*"):
        old.unlink()
    environment = dict(os.environ, LLVM_PROFILE_FILE=str(profiles / "%4m.profraw"))
    for folder in FOLDERS:
        tests = subprocess.run(["ctest", "--test-dir", build / folder, "--no-tests=error", "--output-on-failure",
                                "--parallel", str(os.cpu_count())], env=environment, stdout=subprocess.PIPE)
        if tests.returncode != 0:
            sys.exit(tests.stdout.decode())
    merged = build / "coverage.profdata"
    subprocess.run(["llvm-profdata", "merge", "-sparse", "-o", merged, *profiles.glob("*")], check=True)
    programs = [argument for program in sorted((build / "bin").iterdir()) for argument in ("-object", program)]
    exported = subprocess.run(["llvm-cov", "export", "-instr-profile", merged, build / "lib/libsenseloom.so", *programs],
                              stdout=subprocess.PIPE, stderr=subprocess.DEVNULL, check=True)
    return json.loads(exported.stdout)["data"][0]["functions"]


def add_up(functions):
    """How often each place (file, line, column) of src/ ran, and how often each condition there was true and false."""
    code = collections.Counter()
    true = collections.Counter()
    false = collections.Counter()
    for function in functions:
        files = [pathlib.Path(name) for name in function["filenames"]]
        for line, column, _, _, count, file, _, kind in function["regions"]:
            if kind == CODE and SOURCES in files[file].parents:
                code[files[file], line, column] += count
        for line, column, _, _, times_true, times_false, file, _, _ in function["branches"]:
            if SOURCES in files[file].parents:
                true[files[file], line, column] += times_true
                false[files[file], line, column] += times_false
    return code, true, false


def main():
    if len(sys.argv) != 2:
        sys.exit(__doc__)
    code, true, false = add_up(run_tests(pathlib.Path(sys.argv[1]).resolve()))
    if not code:
        sys.exit("coverage: nothing was counted: is this a build with SENSELOOM_COVERAGE?")

    gaps = collections.defaultdict(list)
    for counts, what in (code, "never runs"), (true, "is never true"), (false, "is never false"):
        for (file, line, column), count in sorted(counts.items()):
            if count == 0:
                gaps[file, line].append(f"column {column} {what}")
    let_off = {(file, number): text.strip() for file in SOURCES.rglob("*.*")
               for number, text in enumerate(file.read_text().splitlines(), 1) if LET_OFF.search(text)}

    lines = {(file, line) for file, line, _ in code}
    print(f"coverage: code on {len(lines)} lines, {2 * len(true)} branches")
    failures = [f"{place[0]}:{place[1]}: {', '.join(what)}" for place, what in gaps.items() if place not in let_off]
    failures += [f"{place[0]}:{place[1]}: is let off and covered" for place in let_off if place not in gaps]
    for file, line in sorted(let_off):
        print(f"let off: {file.relative_to(SOURCES.parent)}:{line}: {let_off[file, line]}")
    if failures:
        sys.exit("\n".join(failures))
    print("coverage: complete")


main()
