"""How well the gesture engine recognises digits, on drawings that it was not learned from.

The drawings in data/ are divided, the templates are learned anew from one part, and the engine is built with them and fed
the other. Of another folder, which is laid out like data/, the engine is fed the drawings as it is built, but for those that
it was learned from. Where there are recordings of daily movement (activity/), the engine as it is built is fed windows of
them, too: it should recognise nothing there.
"""

import csv
import gzip
import os
import pathlib
import random
import shlex
import shutil
import subprocess
import sys
import tempfile

REPOSITORY = pathlib.Path(__file__).resolve().parents[2]
sys.dont_write_bytecode = True
sys.path.insert(0, str(REPOSITORY / "scripts"))
import learn_digits  # noqa: E402

RANDOM_SPLITS = 4
PARTS = 5
WINDOW_MS = (5000, 3000)
HOP_MS = 1000


def drawings_of(folder):
    """The digit, the number and the samples of each drawing, in order of time."""
    result = []
    for digit in range(10):
        drawings = {}
        for row in rows_of(folder / "digits" / f"digit_{digit}.csv.gz"):
            drawings.setdefault(int(row["drawing"]), []).append(samples_of(row))
        result += [(digit, number, samples) for number, samples in drawings.items()]
    return result


def rows_of(path):
    with gzip.open(path, "rt", newline="") as file:
        yield from csv.DictReader(file)


def samples_of(row):
    return tuple(int(row[name]) for name in learn_digits.COLUMNS)


def recognise(build, movements, engine=None, hub=False):
    """What the library finds in each movement: a digit or None; and the microseconds that each took.

    With `hub`, the sensor hub finds the drawing in it."""
    environment = dict(os.environ)
    environment.pop("SENSELOOM_GESTURE_SCRIPT", None)
    if engine:
        environment["LD_LIBRARY_PATH"] = str(engine)
    lines = "".join(" ".join(str(value) for sample in movement for value in sample) + "\n" for movement in movements)
    output = subprocess.run(
        [build / "bin" / "accuracy_recognise", *(["--hub"] if hub else [])], input=lines, env=environment, text=True, check=True, stdout=subprocess.PIPE
    ).stdout.splitlines()
    assert len(output) == len(movements)
    classes = [int(line.split()[0]) for line in output]
    return [found % 10 if found else None for found in classes], [float(line.split()[1]) for line in output]


def results_of(build, drawings, engine=None, hub=False):
    """Of each drawing: its digit, what the library finds, and the microseconds that it took."""
    found, times = recognise(build, [samples for _, _, samples in drawings], engine, hub)
    return [(digit, answer, time) for (digit, _, _), answer, time in zip(drawings, found, times)]


def build_engine(build, learned, folder):
    """Builds the engine into the folder with what is learned from these drawings alone."""
    compiler, inputs = (build / "tests/accuracy/engine.txt").read_text().splitlines()
    groups = [(digit, number, learn_digits.record_of(learn_digits.np.array(samples))) for digit, number, samples in learned]
    (folder / "templates.inc").write_text(learn_digits.learn(groups))
    # A copy, because it takes templates.inc from its own folder first.
    shutil.copy(REPOSITORY / "platform/libgesture/templates.cpp", folder)
    subprocess.run(
        [*shlex.split(compiler), "-o", folder / "libgesture.so", folder / "templates.cpp", *shlex.split(inputs)], check=True
    )


def cross_validate(build, drawings, parts, hub=False):
    """Of the drawings in each part, what is found by an engine that learned from all other parts."""
    results = []
    for part in parts:
        with tempfile.TemporaryDirectory() as name:
            engine = pathlib.Path(name)
            build_engine(build, [drawing for i, drawing in enumerate(drawings) if i not in part], engine)
            tested = [drawings[i] for i in sorted(part)]
            results += results_of(build, tested, engine, hub)
    return results


def random_parts(count, seed):
    order = list(range(count))
    random.Random(seed).shuffle(order)
    return [set(order[i::PARTS]) for i in range(PARTS)]


def parts_by(drawings, key):
    parts = {}
    for i, (_, number, _) in enumerate(drawings):
        parts.setdefault(key(number), set()).add(i)
    return parts


def table_head():
    print("| Drawings fed | Learned from | Number | Right | Wrong | None | ms a drawing, 99 % within |")
    print("| --- | --- | --: | --: | --: | --: | --: |")


def high(microseconds):
    """The ms within which 99 of 100 are."""
    times = sorted(microseconds)
    return times[len(times) * 99 // 100] / 1000


def table_row(fed, learned, results):
    count = len(results)
    right = sum(digit == answer for digit, answer, _ in results)
    none = sum(answer is None for _, answer, _ in results)
    shares = " | ".join(f"{100 * part / count:.1f} %" for part in (right, count - right - none, none))
    print(f"| {fed} | {learned} | {count} | {shares} | {high(time for _, _, time in results):.2f} |", flush=True)


def cross_validation_table(build, drawings):
    table_head()
    for seed in range(1, RANDOM_SPLITS + 1):
        results = cross_validate(build, drawings, random_parts(len(drawings), seed))
        table_row(f"each random fifth (seed {seed})", "the other four fifths", results)
    results = cross_validate(build, drawings, random_parts(len(drawings), 1), hub=True)
    table_row("each random fifth (seed 1), found by the hub", "the other four fifths", results)
    for name, key in (("five drawings of each digit that follow each other", lambda n: n // 5), ("sitting", lambda n: n // 10)):
        parts = parts_by(drawings, key)
        table_row(f"each {name}", "all others", cross_validate(build, drawings, list(parts.values())))
    last = max(parts)  # of the sittings
    early = [part for sitting, part in parts.items() if sitting != last]
    table_row("each sitting but the last", "all others", cross_validate(build, drawings, early))


def built_engine_table(build, folder):
    learned = {tuple(samples) for _, _, samples in drawings_of(REPOSITORY / "data")}
    drawings = [drawing for drawing in drawings_of(folder) if tuple(drawing[2]) not in learned]
    if not drawings:
        print("All drawings there were learned from: nothing to measure.")
        return
    table_head()
    table_row(f"those of {folder}", "data/", results_of(build, drawings))
    table_row(f"those of {folder}, found by the hub", "data/", results_of(build, drawings, hub=True))


def windows_of(path, length):
    """Windows of the length in ms, one each HOP_MS; none if the file has no angular rates."""
    times, samples = [], []
    for row in rows_of(path):
        if not set(learn_digits.COLUMNS) <= set(row):
            return
        times.append(int(row["t_ms"]))
        samples.append(samples_of(row))
    begin = end = 0
    for start in range(times[0], times[-1] - length + 1, HOP_MS):
        while times[begin] < start:
            begin += 1
        while times[end] < start + length:
            end += 1
        if end > begin:
            yield samples[begin:end]


def movement_table(build, folder):
    paths = sorted((folder / "activity").glob("*.csv.gz"))
    fed = {length: [window for path in paths for window in windows_of(path, length)] for length in WINDOW_MS}
    if not any(fed.values()):
        return
    print("\n| Daily movement fed | Hours | Windows | Recognised | ms a window, 99 % within |")
    print("| --- | --: | --: | --: | --: |")
    for length, windows in fed.items():
        found, times = recognise(build, windows)
        accepted = sum(answer is not None for answer in found)
        hours = len(windows) * HOP_MS / 3_600_000
        print(f"| windows of {length / 1000:g} s, one a second | {hours:.1f} | {len(windows)} | {accepted} | {high(times):.2f} |")


def print_tables(build, folder):
    if (folder / "digits").is_dir():
        if folder.resolve() == REPOSITORY / "data":
            cross_validation_table(build, drawings_of(folder))
        else:
            built_engine_table(build, folder)
    movement_table(build, folder)
