#!/usr/bin/env python3
"""Computes the figures of a sweep a second time, from their definitions, and compares: on the recordings of the project
and on made-up traces with several clients, gaps, records of many decisions or none, and truth in part.

second_computation.py TOOL DECISIONS FOLDER [SEED]
"""
import csv
import itertools
import json
import math
import pathlib
import random
import statistics
import subprocess
import sys

RATES = ("results_per_hour", "reports_per_hour", "no_majority_per_hour", "false_per_hour")


class Session:
    """One client of the activity sensor: batches, votes, masks, reports on change."""

    def __init__(self):
        self.wanted = {"mode": 0, "logN": 0, "logM": 0, "classMask": -1, "summary": 1, "weightVar": -1}
        self.size = None  # of a batch; None: records pass

    def ask(self, option):
        defaults = {"mode": 0, "logN": 0, "logM": 0, "classMask": -1, "summary": 1, "weightVar": -1}
        self.wanted = defaults | option
        self.wanted["logM"] = min(self.wanted["logM"], self.wanted["logN"])

    def restart(self, least):
        self.size = 2 ** (self.wanted["logN"] - least)
        self.items, self.members, self.told = [], [], None

    def vote(self):
        if self.size == 1:
            return self.items[0] if self.items[0] < 8 else 0
        weight, total, score = 1024, 0, [0] * 8
        for item in self.items:
            score[item if item < 8 else 0] += weight
            total += weight
            if 0 <= self.wanted["weightVar"] < 11:
                weight += weight >> self.wanted["weightVar"]
        most = max(score)
        return score.index(most) if most > total // 2 else 6

    def take(self, record, items):
        """The classes of the result, or None, and the records of its batch."""
        if self.size is None:
            return items, [record]
        if not items:
            return None, []
        self.items += items[: self.size - len(self.items)]
        self.members.append(record)
        if len(self.items) < self.size:
            return None, []
        out = [self.vote()] if self.wanted["summary"] else list(self.items)
        batch, self.items, self.members = self.members, [], []
        out = [c if self.wanted["classMask"] & (1 << c) else 0 for c in out]
        if self.wanted["mode"] == 1:
            if self.told is not None and all(c == self.told for c in out):
                return None, []
            self.told = out[-1]
        return out, batch


def replay(calls, option):
    """What "me" gets: its records as (time, label, opening), and its results as (record, class or None, batch)."""
    sessions, records, results, opening = {}, [], [], 0
    for call in calls:
        if call["call"] == "open":
            sessions[call["session"]] = Session()
            opening += call["session"] == "me"
        elif call["call"] == "set_option":
            own = call["session"] == "me"
            sessions[call["session"]].ask(call["option"] | (option if own else {}))
        elif call["call"] == "close":
            del sessions[call["session"]]
        elif call["call"] == "dispatch":
            if "me" not in sessions or call.get("session", "me") != "me":
                continue
            number = len(records)
            records.append((call["record"]["timestamp"], call.get("truth", 0), opening))
            items = [item["class"] for item in call["record"]["items"]]
            out, batch = sessions["me"].take(number, items)
            if out is not None:
                results.append((number, out[-1] if out else None, batch))
        if call["call"] in ("set_option", "close"):
            for session in sessions.values():
                session.restart(min(each.wanted["logM"] for each in sessions.values()))
    return records, results


def opened_anew(records, before, after):
    return records[before][2] != records[after][2]


class Tally:
    """What is counted over all traces."""

    def __init__(self):
        self.hours = self.known = self.right = self.labelled = 0
        self.count = dict.fromkeys(RATES, 0)
        self.changes, self.missed, self.delays, self.waits = 0, 0, [], []

    def add(self, records, results, per_second):
        labels = [label for _, label, _ in records]
        times = [time / per_second for time, _, _ in records]
        stays = [times[i + 1] - times[i] if not opened_anew(records, i, i + 1) else 0 for i in range(len(times) - 1)]

        def held(before):
            """The class of the last result up to a record."""
            past = [c for at, c, _ in results if at <= before and c is not None]
            return past[-1] if past else None

        self.known = self.known or any(labels)
        self.hours += sum(stays) / 3600
        self.waits += [times[at] - times[batch[0]] for at, _, batch in results]
        self.labelled += sum(stay for stay, label in zip(stays, labels) if label)
        self.right += sum(stay for i, (stay, label) in enumerate(zip(stays, labels)) if label and held(i) == label)
        self.add_reports(labels, results, held)
        self.add_changes(labels, times, results, held)

    def add_reports(self, labels, results, held):
        self.count["results_per_hour"] += len(results)
        for at, c, batch in results:
            self.count["no_majority_per_hour"] += c == 6
            earlier = held(at - 1)
            if c is None or earlier is None or c == earlier:
                continue
            self.count["reports_per_hour"] += 1
            batch_labels = [labels[i] for i in batch]
            self.count["false_per_hour"] += c != 6 and all(batch_labels) and c not in batch_labels

    def add_changes(self, labels, times, results, held):
        for i, label in enumerate(labels):
            before = [other for other in labels[:i] if other]
            if not label or not before or before[-1] == label:
                continue
            self.changes += 1
            others = [j for j in range(i, len(labels)) if labels[j] not in (0, label)]
            end = max(j for j in range(i, others[0] if others else len(labels)) if labels[j] == label)
            heard = [at for at, c, _ in results if i <= at <= end and c == label]
            if held(i - 1) == label:
                self.delays.append(0)
            elif heard:
                self.delays.append(times[heard[0]] - times[i])
            else:
                self.missed += 1


def figures(traces, option, per_second):
    """The figures, as the definitions say."""
    tally = Tally()
    for calls in traces:
        tally.add(*replay(calls, option), per_second)
    delays = sorted(tally.delays)
    found = {name: (value / tally.hours if tally.hours else None) for name, value in tally.count.items()}
    found |= {
        "changes": tally.changes,
        "missed": tally.missed,
        "delay_median_s": statistics.median(delays) if delays else None,
        "delay_p90_s": delays[math.ceil(len(delays) * 9 / 10) - 1] if delays else None,
        "right": tally.right / tally.labelled if tally.labelled else None,
    }
    if not tally.known:
        for name in ("false_per_hour", "changes", "missed", "delay_median_s", "delay_p90_s", "right"):
            found[name] = None
        found["batch_median_s"] = statistics.median(tally.waits) if tally.waits else None
    return found


def compare(tool, folder, traces, axes, unit, base=None):
    """Has the tool sweep the traces, and compares every figure. Returns how many combinations there were."""
    files = []
    for number, calls in enumerate(traces):
        files.append(str(folder / f"{number}.jsonl"))
        pathlib.Path(files[-1]).write_text("".join(json.dumps(call) + "\n" for call in calls))
    client = ["--session", "me"] if base is None else ["--sensor", "PHYAC", "--option", json.dumps(base)]
    sets = [f"--set={key}={','.join(map(str, values))}" for key, values in axes.items()]
    if base is not None:
        opened = [{"call": "open", "session": "me"}, {"call": "set_option", "session": "me", "option": base}]
        traces = [opened + calls for calls in traces]
    done = subprocess.run([tool, "sweep", "--json", "--time-unit", unit, *client, *sets, *files],
                          capture_output=True, text=True, check=False)
    if done.returncode not in (0, 2):
        sys.exit(f"status {done.returncode}: {done.stderr}")
    rows = [json.loads(line) for line in done.stdout.splitlines()]
    combinations = list(itertools.product(*axes.values()))
    if len(rows) != len(combinations):
        sys.exit(f"{len(rows)} rows of {len(combinations)}: {done.stderr}")
    per_second = {"s": 1, "ms": 1000}[unit]
    for row, values in zip(rows, combinations):
        option = dict(zip(axes, values))
        for name, expected in figures(traces, option, per_second).items():
            got = row[name]
            same = got == expected if None in (got, expected) else math.isclose(got, expected, rel_tol=1e-8, abs_tol=1e-8)
            if not same:
                sys.exit(f"{option}: {name} is {got}, and should be {expected}; the traces are in {folder}")
        if any(row["option"][key] != value for key, value in option.items()):
            sys.exit(f"{row['option']} is not the option {option}")
    return len(rows)


def recordings(file):
    """The project's recordings, as calls."""
    with open(file, encoding="utf-8") as table:
        for _, rows in itertools.groupby(csv.DictReader(table), key=lambda row: row["recording"]):
            yield [
                {"call": "dispatch", "sensor": "PHYAC", "truth": int(row["truth"]),
                 "record": {"timestamp": round(float(row["t_s"]) * 1000),
                            "items": [{"class": int(row["decision"]), "seq": 0}]}}
                for row in rows
            ]


def made_up(random_numbers, with_truth):
    """A trace with "me" and others, who come, ask and go."""
    others = 0
    time = 0
    calls = [{"call": "open", "session": "me", "sensor": "PHYAC"}]
    is_open = True
    label = 1
    for _ in range(random_numbers.randrange(1, 120)):
        time += random_numbers.choice((1, 1, 1, 2, 7, 0))
        if random_numbers.random() < 0.1:
            label = random_numbers.choice((0, 1, 2, 3))
        guess = label if random_numbers.random() < 0.7 else random_numbers.randrange(9)
        items = [{"class": guess, "seq": 0}] * random_numbers.choice((1, 1, 1, 1, 0, 2, 3))
        call = {"call": "dispatch", "sensor": "PHYAC", "record": {"timestamp": time, "items": items}}
        if with_truth and random_numbers.random() < 0.9:
            call["truth"] = label
        calls.append(call)
        what = random_numbers.random()
        if what < 0.02:
            others += 1
            calls.append({"call": "open", "session": f"other {others}", "sensor": "PHYAC"})
        elif what < 0.06 and others:
            option = {"logN": random_numbers.randrange(5), "logM": random_numbers.randrange(3)}
            calls.append({"call": "set_option", "session": f"other {others}", "option": option})
        elif what < 0.07 and others:
            calls.append({"call": "close", "session": f"other {others}"})
            others -= 1
        elif what < 0.10 and is_open:
            calls.append({"call": "set_option", "session": "me", "option": {"logM": random_numbers.randrange(3)}})
        elif what < 0.11 and is_open:
            calls.append({"call": "close", "session": "me"})
            is_open = False
        elif what < 0.2 and not is_open:
            calls.append({"call": "open", "session": "me", "sensor": "PHYAC"})
            is_open = True
    return calls


def with_own_options(calls):
    """Where "me" sets no option after it opens, the sweep has it set one at once."""
    for i, call in enumerate(calls):
        yield call
        if call["call"] != "open" or call["session"] != "me":
            continue
        rest = itertools.takewhile(lambda each: (each["call"], each.get("session")) != ("close", "me"), calls[i + 1:])
        if not any(each["call"] == "set_option" and each["session"] == "me" for each in rest):
            yield {"call": "set_option", "session": "me", "option": {}}


def main():
    tool, decisions, folder = sys.argv[1], sys.argv[2], pathlib.Path(sys.argv[3])
    folder.mkdir(parents=True, exist_ok=True)
    seed = int(sys.argv[4]) if len(sys.argv) > 4 else random.randrange(2**32)
    print(f"seed {seed}")
    random_numbers = random.Random(seed)

    real = list(recordings(decisions))
    axes = {"logN": [0, 1, 2, 4], "weightVar": [-1, 0, 2], "mode": [0, 1]}
    count = compare(tool, folder, real, axes, "ms", {})
    count += compare(tool, folder, real[:1], {"logN": [3], "summary": [0, 1], "classMask": [164, 228]}, "ms", {"mode": 1})
    axes = {"mode": [0, 1], "logN": [0, 1, 2], "weightVar": [-1, 1], "summary": [0, 1], "classMask": [-1, 6]}
    for _ in range(40):
        traces = [made_up(random_numbers, random_numbers.random() < 0.8) for _ in range(random_numbers.randrange(1, 4))]
        count += compare(tool, folder, [list(with_own_options(calls)) for calls in traces], axes, "s")
    print(f"{count} combinations compared")


main()
