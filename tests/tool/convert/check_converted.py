#!/usr/bin/env python3
"""Converts every example, and fails unless the trace events are what their format says they are, and they and the table
tell the same as `senseloom explain`: check_converted.py TOOL SOURCE
"""
import collections
import csv
import io
import json
import os
import pathlib
import subprocess
import sys

import jsonschema

tool, source = (pathlib.Path(argument).resolve() for argument in sys.argv[1:3])
environment = dict(os.environ, SENSELOOM_GESTURE_SCRIPT=str(source / "examples" / "gesture_hmm.script"))


def run(*arguments):
    done = subprocess.run([tool, *arguments], env=environment, capture_output=True, text=True, check=True)
    return done.stdout


def check(is_so, *what):
    if not is_so:
        sys.exit(" ".join(str(part) for part in what))


def check_slices(events, trace):
    """On a track, a slice lies within another or beside it."""
    tracks = collections.defaultdict(list)
    for event in events:
        if event["ph"] == "X":
            tracks[event["pid"], event["tid"]].append((event["ts"], -event["dur"]))
    for slices in tracks.values():
        open_until = []
        for start, length in sorted(slices):
            while open_until and open_until[-1] <= start:
                open_until.pop()
            check(not open_until or start - length <= open_until[-1], trace, "slices overlap at", start)
            open_until.append(start - length)


def check_events(trace, accounts, validator):
    events = json.loads(run("convert", "--to", "perfetto", trace))
    for error in validator.iter_errors(events):
        sys.exit(f"{trace}: {error.message} at {list(error.path)}")
    events = events["traceEvents"]
    names = {(event["pid"], event["tid"]): event["args"]["name"] for event in events if event["name"] == "thread_name"}
    sensors = {event["pid"]: event["args"]["name"].split()[0] for event in events if event["name"] == "process_name"}
    check_slices(events, trace)
    counts = collections.Counter((event["cat"], names[event["pid"], event["tid"]], sensors[event["pid"]])
                                 for event in events if event["ph"] in "iX")
    for account in accounts:
        who = account["account"], account["sensor"]
        lasting = ("class", *who) in counts
        delivered = account["fates"].get("delivered", 0)
        check(lasting or counts["result", *who] == delivered, trace, who, "has", delivered, "results")
        check(not lasting or 0 < counts["class", *who] <= delivered, trace, who, "has other classes")


def check_table(trace, accounts):
    rows = list(csv.DictReader(io.StringIO(run("convert", "--to", "csv", trace))))
    calls = run("replay", "--json", "--log", "none", trace).splitlines()
    check(len(rows) == len(calls), trace, "has", len(calls), "calls and", len(rows), "rows")
    fates = collections.Counter((row["session"], row["sensor"], row["fate"]) for row in rows if row["call"] == "dispatch")
    for account in accounts:
        for fate, count in account["fates"].items():
            check(fates[account["account"], account["sensor"], fate] == count, trace, account, fate)
    for row, line in zip(rows, calls):
        call = json.loads(line)
        check((row["call"], row["line"]) == (call["call"], str(call["line"] or "")), trace, row)
        result = call.get("result") or {}
        check(not result or row["result_timestamp"] == str(result["timestamp"]), trace, row)
        check(call["call"] != "dispatch" or bool(row["result_timestamp"]) == (call["return"] == 1), trace, row)
        items = result.get("items")
        if items is not None:
            check(row["result_items"] == str(len(items)), trace, row)
            classes = [str(item["class"]) for item in items if isinstance(item, dict)]
            check(row["result_classes"].split() == classes, trace, row)


def main():
    schema = json.loads((pathlib.Path(__file__).parent / "trace_events.schema.json").read_text())
    jsonschema.Draft202012Validator.check_schema(schema)
    validator = jsonschema.Draft202012Validator(schema)
    examples = sorted((source / "examples").glob("*.jsonl"))
    check(len(examples) >= 12, "too few examples")
    for trace in examples:
        explained = [json.loads(line) for line in run("explain", "--json", trace).splitlines()]
        accounts = [line for line in explained if "account" in line]
        check(accounts, trace, "has no accounts")
        check_events(trace, accounts, validator)
        check_table(trace, accounts)


main()
