#!/usr/bin/env python3
"""Changes one operator, constant or statement of src/ at a time, and tells which changes no test notices.

  mutants.py                    tries every mutant; fails when the tests kill too few
  mutants.py --list             lists the mutants instead
  mutants.py --only TEXT ...    only mutants whose name contains one of the TEXTs
  mutants.py --equivalent       only those listed in mutants-equivalent.txt, and fails for any that a test kills
  mutants.py --jobs N           in N copies of the tree, below build/mutants; else in one a processor
  mutants.py --verbose          prints every mutant's fate, and not the survivors alone

A mutant is named by its file, the changed line as it is, and as it becomes; by no line number, so that the name lasts.

A mutant is built like the product for the host's word size, with the C++ library's checks of bounds on top. When the
shared library comes out the same to the byte, no test could tell, and the mutant does not count; neither does one that
does not compile, nor one that is listed, with its reason, in mutants-equivalent.txt. The others are killed by any test
of behaviour that fails, crashes or does not end: first by what runs on the shared library and so needs no linking, with
what killed the last mutant of the file at the front. Nothing is random: addresses and the seed of the tests are fixed.
"""

import argparse
import collections
import contextlib
import itertools
import os
import pathlib
import re
import resource
import signal
import subprocess
import sys
import threading
import time

ROOT = pathlib.Path(__file__).resolve().parent.parent
EQUIVALENT = pathlib.Path(__file__).with_name("mutants-equivalent.txt")
LEAST_SCORE = 0.98
MOST_MEMORY = 4 << 30  # bytes: a mutant can allocate without end

SWAPS = {
    "==": ["!="], "!=": ["=="], "<": ["<=", ">="], "<=": ["<", ">"], ">": [">=", "<="], ">=": [">", "<"],
    "&&": ["||"], "||": ["&&"], "+": ["-"], "-": ["+"], "*": ["/"], "/": ["*"], "%": ["*"], "|": ["&"], "&": ["|"],
    "<<": [">>"], ">>": ["<<"], "+=": ["-="], "-=": ["+="], "*=": ["/="], "|=": ["&="], "&=": ["|="],
    "++": ["--"], "--": ["++"], "true": ["false"], "false": ["true"],
}
ANYWHERE = {"++", "--", "true", "false"}  # what is no operator of two operands
LABELS = {"case", "default", "public", "protected", "private"}
OTHER_NAMES = {
    "std::min": "std::max", "std::max": "std::min",
    "Merge::bitOr": "Merge::minimum", "Merge::minimum": "Merge::bitOr", "Merge::maximum": "Merge::bitOr",
    "Merge::allOne": "Merge::bitOr", "Merge::anySet": "Merge::keepFirst", "Merge::keepFirst": "Merge::bitOr",
    "Merge::takeLast": "Merge::keepFirst", "OutOfRange::kept": "OutOfRange::replaced",
    "OutOfRange::clamped": "OutOfRange::kept", "OutOfRange::replaced": "OutOfRange::kept",
}

Token = collections.namedtuple("Token", "kind text start end")
Mutant = collections.namedtuple("Mutant", "name file start end replacement")


# --- Which mutants there are -----------------------------------------------------------------------------------------

TOKEN = re.compile(
    r"""(?P<nothing> //[^\n]* | ^[ \t]*\#[^\n]* | \s+ )
      | (?P<string> "(?:\\.|[^"\\])*" )
      | (?P<character> '(?:\\.|[^'\\])' )
      | (?P<number> 0[xX][\da-fA-F]+[uU]? | \d+[uU]? )
      | (?P<word> [A-Za-z_]\w*(?:::\w+)* )
      | (?P<operator> [-+*/%|&^<>=!]= | && | \|\| | << | >> | \+\+ | -- | -> | \.\.\. | . )""",
    re.VERBOSE | re.MULTILINE)


def tokens_of(text):
    """The tokens, but for what is checked or chosen while compiling."""
    tokens = [Token(match.lastgroup, match.group(), *match.span())
              for match in TOKEN.finditer(text) if match.lastgroup != "nothing"]
    kept = []
    index = 0
    while index < len(tokens):
        if tokens[index].text in ("static_assert", "assert"):
            index = closing(tokens, index + 1, "(", ")")
        elif tokens[index].text == "template":
            index = closing(tokens, index + 1, "<", ">")
        else:
            kept.append(tokens[index])
        index += 1
    return kept


def closing(tokens, index, opener, closer):
    """The index of the bracket that closes the one at `index`."""
    depth = 0
    while True:
        depth += {opener: 1, closer: -1}.get(tokens[index].text, 0)
        if depth == 0:
            return index
        index += 1


def changes_of(text, file):
    """(start, end, replacement) of each change, in the order of the text."""
    if file.endswith(".def"):
        return [(*match.span(), "") for match in re.finditer(r"^SENSOR_KIND.*", text, re.MULTILINE)]
    tokens = tokens_of(text)
    changes = []
    for index, token in enumerate(tokens):
        before = tokens[index - 1].text if index > 0 else ""
        after = tokens[index + 1].text if index + 1 < len(tokens) else ""
        # The format leaves blanks around operators of two operands, and none around those of types.
        binary = text[token.start - 1].isspace() and text[token.end].isspace()
        if token.text in SWAPS and (binary or token.text in ANYWHERE):
            changes += [(token.start, token.end, other) for other in SWAPS[token.text]]
        elif token.text in ("!", "~", "-") and not (token.text == "-" and tokens[index + 1].kind == "number"):
            changes.append((token.start, token.end, ""))
        elif token.text in OTHER_NAMES and before != "case":
            changes.append((token.start, token.end, OTHER_NAMES[token.text]))
        elif token.kind == "character" and len(token.text) == 3:
            changes.append((token.start, token.end, f"'{chr(ord(token.text[1]) + 1)}'"))
        elif token.kind == "number" and not (before == "=" and re.match(r"\)|const|noexcept", tokens[index - 2].text)):
            number = int(token.text.rstrip("uU"), 0)
            changes.append((token.start, token.end, str(0 if number == 1 else number + 1)))
        elif token.text in ("if", "for", "while") and after == "(":
            changes += conditions(tokens, index)
    changes += statements(text, tokens)
    return sorted(set(changes))


def conditions(tokens, index):
    """The condition of an if, a for or a while as a constant."""
    end = closing(tokens, index + 1, "(", ")")
    parts = [index + 1, *(i for i in range(index + 2, end) if tokens[i].text == ";"), end]
    keyword = tokens[index].text
    if keyword == "for" and len(parts) < 4:
        return []  # over a range
    first, last = (parts[1], parts[2]) if keyword == "for" else parts[-2:]
    return [(tokens[first + 1].start, tokens[last - 1].end, value)
            for value in (("true", "false") if keyword == "if" else ("false",))]


def statements(text, tokens):
    """Statements left out, and results that are returned as 0, false or null."""
    changes = []
    scopes = []  # (kind, parentheses around it, first token of the statement that it is part of)
    heads = []  # for each open parenthesis, whether a statement of its own follows it
    first = 0  # token of the statement
    for index, token in enumerate(tokens):
        kind, around, outer = scopes[-1] if scopes else ("type", 0, 0)
        if token.text == "(":
            heads.append(tokens[index - 1].text in ("if", "for", "while", "switch"))
        elif token.text == ")":
            if heads.pop():
                first = index + 1
        elif token.text == "{":
            scopes.append((scope_kind(tokens[first:index]), len(heads), first))
            first = index + 1
        elif token.text == "}":
            scopes.pop()
            first = outer if kind == "value" else index + 1
        elif token.text == "else" or token.text == ":" and tokens[first].text in LABELS:
            first = index + 1
        elif token.text == ";" and len(heads) == around:
            start, end = tokens[first].start, tokens[index - 1].end
            if kind == "block" and start < end:
                changes += statement(text[start:end], start, end)
            first = index + 1
    return changes


def scope_kind(tokens):
    """What the brace behind those tokens opens."""
    words = [token.text for token in tokens]
    if words and words[-1] in (")", "const", "noexcept", "override", "else", "try"):
        return "block"
    return "type" if {"namespace", "class", "struct", "enum", "extern"} & set(words) else "value"


def statement(code, start, end):
    if code.startswith("return "):
        literal = re.fullmatch(r"return (-?\d+|true|false|nullptr|\{\})", code)
        return [] if literal else [(start, end, "return {}")]
    if re.match(r"(break|continue|return|throw|delete)\b", code):
        return [(start, end, "")]
    if re.match(r"(\*|\+\+|--)?[\w:]+(\.|->|\[|\(| [-+*/|&]?= )", code) or re.match(r"(\+\+|--)\w|\w+(\+\+|--)$", code):
        return [(start, end, "")]
    return []


def mutants_of(file):
    text = (ROOT / file).read_text(encoding="utf-8")
    times = collections.Counter()
    mutants = []
    for start, end, replacement in changes_of(text, file):
        line_start = text.rfind("\n", 0, start) + 1
        line_end = text.find("\n", end)
        old = text[line_start:line_end]
        new = text[line_start:start] + replacement + text[end:line_end]
        name = f"{file}: {without_comments(old)} ==> {without_comments(new)}".rstrip()
        times[name] += 1
        if times[name] > 1:
            name += f" #{times[name]}"
        mutants.append(Mutant(name, file, start, end, replacement))
    return mutants


def without_comments(lines):
    return " ".join(re.sub(r"//.*", "", lines).split())


def listed_equivalents():
    """The names in mutants-equivalent.txt, where the lines that begin with blanks are names, the others reasons."""
    lines = EQUIVALENT.read_text(encoding="utf-8").splitlines() if EQUIVALENT.exists() else []
    return [line.strip() for line in lines if line.startswith(" ")]


# --- What becomes of them --------------------------------------------------------------------------------------------

# The C++ library's headers precompiled, for speed, and its checks of bounds, which sanitizers' builds have, too.
OF_THE_LIBRARY = """
target_compile_definitions(senseloom_objects PRIVATE _GLIBCXX_ASSERTIONS)
target_precompile_headers(senseloom_objects PRIVATE <algorithm> <array> <cstring> <iterator> <limits> <memory> <span>
                          <utility> <vector>)
"""


def adapted(file, text):
    """The text of a file for a build that takes less time."""
    return text + OF_THE_LIBRARY if file == "src/CMakeLists.txt" else text


class Program:
    """A test program."""

    def __init__(self, name, shared, arguments=("--gtest_fail_fast",)):
        self.name, self.shared, self.arguments = name, shared, arguments
        self.filters = ["*"]  # each for a run of its own
        self.seconds = 0.0


# Those of the library's behaviour, on the shared library and with its objects linked in.
ON_THE_LIBRARY = ("api_audio_device_test", "api_first_calls_test", "api_header_test", "api_locale_test",
                  "api_object_layout_test", "api_odd_arguments_test", "oracle_test")
WITH_ITS_OBJECTS = ("allocation_failure_test", "exhaustion_test", "stress_test", "unit_test")


def test_programs():
    cases = Program("case_runner", True, sorted((ROOT / "tests" / "cases").glob("*.jsonl")))
    return [cases, *(Program(name, True) for name in ON_THE_LIBRARY), *(Program(name, False) for name in WITH_ITS_OBJECTS)]


class Copy:
    """A copy of the tree, and its build."""

    def __init__(self, folder):
        self.tree = folder / "tree"
        self.build = folder / "build"
        self.runs = folder / "runs"
        self.runs.mkdir(parents=True, exist_ok=True)
        files = subprocess.run(["git", "ls-files", "-z"], cwd=ROOT, stdout=subprocess.PIPE, text=True, check=True)
        for file in files.stdout.rstrip("\0").split("\0"):
            self.take(file)

    def take(self, file):
        """Takes over a file, but leaves one that is the same, for nothing to be built anew."""
        source, target = ROOT / file, self.tree / file
        if not source.is_file():
            return
        content = source.read_bytes()
        if file.endswith("CMakeLists.txt"):
            content = adapted(file, content.decode()).encode()
        if not target.exists() or target.read_bytes() != content:
            target.parent.mkdir(parents=True, exist_ok=True)
            target.write_bytes(content)
            target.chmod(source.stat().st_mode)

    def configure(self):
        compiling = "<CMAKE_CXX_COMPILER> <DEFINES> <INCLUDES> <FLAGS> -w -g0 -o <OBJECT> -c <SOURCE>"
        subprocess.run(
            ["cmake", "--preset", "native", "-B", self.build, "-DBUILD_TESTING=ON", "-DCMAKE_LINK_DEPENDS_NO_SHARED=ON",
             f"-DCMAKE_CXX_COMPILE_OBJECT={compiling}"], cwd=self.tree, stdout=subprocess.DEVNULL, check=True)

    def make(self, jobs, *targets):
        """Whether the targets were built."""
        return subprocess.run(["ninja", f"-j{jobs}", "--quiet", *targets], cwd=self.build, stdout=subprocess.DEVNULL,
                              stderr=subprocess.DEVNULL, check=False).returncode == 0

    def built_library(self):
        return (self.build / "lib" / "libsenseloom.so").read_bytes()

    def passes(self, program, only, timeout):
        """Whether the tests that a filter tells pass in time."""
        command = ["setarch", "--addr-no-randomize", self.build / "bin" / program.name, *program.arguments]
        if only != "*":
            command.append("--gtest_filter=" + only)
        settings = {"SENSELOOM_TEST_SEED": "1", "LOCPATH": str(self.build / "tests" / "locales")}
        run = subprocess.Popen(command, cwd=self.runs, env={**os.environ, **settings}, stdout=subprocess.DEVNULL,
                               stderr=subprocess.DEVNULL, start_new_session=True)
        try:
            return run.wait(timeout) == 0
        except subprocess.TimeoutExpired:
            return False
        finally:
            with contextlib.suppress(ProcessLookupError):
                os.killpg(run.pid, signal.SIGKILL)  # with what the program started itself and has not ended
            run.wait()

    def calibrate(self, program):
        """Finds how long a program takes, and whether it needs a process for each of its tests."""
        started = time.monotonic()
        if not self.passes(program, "*", 600):
            program.filters = self.names(program)
            started = time.monotonic()
            if not all(self.passes(program, test, 600) for test in program.filters):
                sys.exit(f"{program.name} fails without any mutant")
        program.seconds = time.monotonic() - started

    def names(self, program):
        listing = subprocess.run([self.build / "bin" / program.name, "--gtest_list_tests"], stdout=subprocess.PIPE,
                                 text=True, check=True)
        suite, tests = "", []
        for line in listing.stdout.splitlines():
            name = line.split("#")[0].rstrip()
            if line.startswith(" "):
                tests.append(suite + name.strip())
            elif name.endswith("."):
                suite = name
        return tests

    def fate(self, mutant, programs, library):
        """What becomes of a mutant."""
        original = self.tree / mutant.file
        text = original.read_text(encoding="utf-8")
        original.write_text(text[:mutant.start] + mutant.replacement + text[mutant.end:], encoding="utf-8")
        try:
            if not self.make(1, "senseloom"):
                return "does not compile"
            if self.built_library() == library:
                return "same code"
            for program in programs:
                if not program.shared and not self.make(1, program.name):
                    return f"killed by building {program.name}"
                timeout = 5 + 10 * program.seconds
                for only in program.filters:
                    if not self.passes(program, only, timeout):
                        return f"killed by {program.name}"
            return "survived"
        finally:
            original.write_text(text, encoding="utf-8")


def made_copies(jobs, programs):
    """Copies of the tree, each built, with the time that each program takes."""
    resource.setrlimit(resource.RLIMIT_AS, (MOST_MEMORY, MOST_MEMORY))
    resource.setrlimit(resource.RLIMIT_CORE, (0, 0))
    copies = [Copy(ROOT / "build" / "mutants" / str(number)) for number in range(jobs)]
    for copy in copies:
        copy.configure()
        if not copy.make(jobs, "senseloom", "locale_ps_AF", *(program.name for program in programs)):
            sys.exit(f"the build in {copy.build} fails without any mutant")
    for program in programs:
        copies[0].calibrate(program)
    return copies


def fates_of(mutants, jobs, verbose):
    """What becomes of each mutant, by its name."""
    programs = test_programs()
    copies = made_copies(jobs, programs)
    fates = {}
    last_killers = {}  # by file: what killed one of its mutants often kills the next
    queue = iter(mutants)
    lock = threading.Lock()

    def work(copy):
        library = copy.built_library()
        while True:
            with lock:
                mutant = next(queue, None)
            if mutant is None:
                return
            order = sorted(programs, key=lambda program: (not program.shared,
                                                          program.name != last_killers.get(mutant.file),
                                                          program.seconds))
            fate = copy.fate(mutant, order, library)
            with lock:
                last_killers[mutant.file] = fate.split()[-1]
                fates[mutant.name] = fate
                if verbose:
                    print(f"{fate}: {mutant.name}", flush=True)
                elif sys.stderr.isatty():
                    print(f"{len(fates)} of {len(mutants)}", end="\r", file=sys.stderr)

    workers = [threading.Thread(target=work, args=(copy,)) for copy in copies]
    for worker in workers:
        worker.start()
    for worker in workers:
        worker.join()
    return fates


def main():
    parser = argparse.ArgumentParser(description=__doc__, formatter_class=argparse.RawDescriptionHelpFormatter)
    parser.add_argument("--list", action="store_true")
    parser.add_argument("--only", nargs="+", default=[""], metavar="TEXT")
    parser.add_argument("--equivalent", action="store_true")
    parser.add_argument("--jobs", type=int, default=os.cpu_count(), metavar="N")
    parser.add_argument("--verbose", action="store_true")
    arguments = parser.parse_args()

    files = sorted(str(path.relative_to(ROOT)) for path in (ROOT / "src").rglob("*")
                   if path.suffix in (".cpp", ".h", ".def"))
    mutants = [mutant for file in files for mutant in mutants_of(file)]
    listed = listed_equivalents()
    stale = sorted(set(listed) - {mutant.name for mutant in mutants})
    mutants = [mutant for mutant in mutants if any(text in mutant.name for text in arguments.only)]
    equivalent = {mutant.name for mutant in mutants} & set(listed)
    if arguments.list:
        for mutant in mutants:
            print(mutant.name + ("  (equivalent)" if mutant.name in equivalent else ""))
        return
    mutants = [mutant for mutant in mutants if (mutant.name in equivalent) == arguments.equivalent]

    started = time.monotonic()
    fates = fates_of(mutants, arguments.jobs, arguments.verbose)
    minutes = (time.monotonic() - started) / 60

    for name in stale:
        print(f"listed as equivalent, but there is no such mutant: {name}")
    failed = report(fates, arguments.equivalent, minutes, len(equivalent))
    sys.exit(1 if stale or failed else 0)


def report(fates, are_equivalent, minutes, listed):
    """Prints what became of the mutants; returns whether that is a failure."""
    failed = False
    for name, fate in sorted(fates.items()):
        if are_equivalent and fate != "survived":
            print(f"listed as equivalent, but {fate}: {name}")
            failed = True
        elif fate == "survived" and not are_equivalent:
            print(f"survived: {name}")
    counts = collections.Counter(fate.split()[0] for fate in fates.values())
    print(f"{len(fates)} mutants in {minutes:.0f} minutes: {counts['does']} do not compile, {counts['same']} are the "
          f"same code, {counts['survived']} survived, {counts['killed']} killed")
    if are_equivalent:
        return failed
    tried = counts["killed"] + counts["survived"]
    score = counts["killed"] / tried if tried else 1.0
    print(f"{score:.1%} killed, and {listed} more listed as equivalent")
    return score < LEAST_SCORE


if __name__ == "__main__":
    main()
