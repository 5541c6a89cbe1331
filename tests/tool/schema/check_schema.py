#!/usr/bin/env python3
"""Compares traces with the schema, and makes recordings to compare: check_schema.py ROOT TOOL DRIVEN

All examples, the lines that docs/traces.md shows, and recordings with everything that a recording can have must be as
the schema says; lines that are damaged in one place each must not be."""

import copy
import glob
import json
import os
import re
import subprocess
import sys
import tempfile

import jsonschema

# Ends in a breach of the contract that the program does not survive.
SCRIPT = """open a PHYAC
set a {"logN":2}
set a {"logN":1}
keep a {"logN":1}
drop 0
drop 9
repeat a 9
dispatch missing 1
open b PHYAC
set b {"logN":3}
set b [
race b {"logN":2}
open c STAP
set c {"level":99}
open d NONE
repeat a 21
repeat c 20
close b
stale a c
close c
dispatch c 3
signal 15
"""


def lines_of(text):
    return [json.loads(line) for line in text.splitlines() if line.strip()]


def shown(root):
    with open(os.path.join(root, "docs/traces.md"), encoding="utf-8") as page:
        return lines_of("\n".join(re.findall(r"^    (\{.*\})$", page.read(), re.MULTILINE)))


def recorded(tool, driven):
    lines = []
    with tempfile.TemporaryDirectory() as folder:
        for options in [], ["--max-size", "3k"]:
            trace = os.path.join(folder, f"{len(options)}.jsonl")
            subprocess.run([tool, "record", "-o", trace, *options, "--", driven], input=SCRIPT, text=True,
                           stdout=subprocess.DEVNULL, stderr=subprocess.DEVNULL, check=False)
        limited = os.path.join(folder, "limited.jsonl")
        subprocess.run([tool, "record", "-o", limited, "--", driven],
                       input="limit 4096\nopen a LIFT\n" + f"set a {'x' * 2500}\n" * 3 + "close a\n", text=True,
                       stdout=subprocess.DEVNULL, stderr=subprocess.DEVNULL, check=False)
        for name in sorted(glob.glob(os.path.join(folder, "*"))):
            with open(name, encoding="utf-8") as trace:
                lines += lines_of(trace.read())
    return lines


def members(lines):
    return {member for line in lines for member in line}


def damaged(line):
    """The line with each of its members in turn of a type that none has."""
    for member in line:
        other = copy.deepcopy(line)
        other[member] = 1.5
        yield other


def main():
    root, tool, driven = sys.argv[1:]
    with open(os.path.join(root, "docs/trace.schema.json"), encoding="utf-8") as file:
        schema = json.load(file)
    jsonschema.Draft202012Validator.check_schema(schema)
    validator = jsonschema.Draft202012Validator(schema)
    recording = recorded(tool, driven)
    lines = recording + shown(root)
    for name in glob.glob(os.path.join(root, "examples/*.jsonl")):
        with open(name, encoding="utf-8") as trace:
            lines += lines_of(trace.read())[:50]

    sensors = subprocess.run([tool, "sensors", "--json"], stdout=subprocess.PIPE, text=True, check=True).stdout
    named = {sensor["sensor"] for sensor in lines_of(sensors)}
    if set(schema["$defs"]["sensor"]["enum"]) != named:
        sys.exit(f"the schema does not name the tool's sensors: {sorted(named)}")

    for line in lines:
        for error in validator.iter_errors(line):
            sys.exit(f"{json.dumps(line)}: {error.message}")
    known = set(re.findall(r'"(\w+)":', json.dumps(schema["$defs"])))
    if members(lines) - known:
        sys.exit(f"not in the schema: {members(lines) - known}")
    expected = {"format", "end", "lost", "why", "cause", "refused", "breach", "threads", "atUs", "tookNs"}
    if expected - members(recording):
        sys.exit(f"not in any recording: {expected - members(recording)}")
    for line in {tuple(line): line for line in recording}.values():
        for other in damaged(line):
            if validator.is_valid(other):
                sys.exit(f"the schema takes {json.dumps(other)}")


main()
