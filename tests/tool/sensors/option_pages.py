#!/usr/bin/env python3
"""Makes docs/options.md and docs/man/senseloom-options.7 of what `senseloom sensors --json` prints, and fails unless
they are what is in the project. With --write, they become that.

option_pages.py TOOL SOURCE [--write]
"""
import json
import pathlib
import subprocess
import sys

HEAD = "What every option key, every property and every field of a record means, as `senseloom sensors` prints it."
WORDS = [
    ("default", "the value of a key that a client does not give, or not as an integer"),
    ("out of range", "what becomes of a value that is not in the range; nothing is said where the range has no end"),
    ("merged to", "what the values of all sessions of the sensor become together"),
    ("property", "what the caller gets after a negotiation, to configure the sensor with"),
    ("field", "what a record has, by its name in traces"),
]


def range_text(key):
    low, high = key["range"] or (1, 0)
    if low > high:
        return "none"
    ends = ["" if abs(end) >= 2**31 - 1 else str(end) for end in (low, high)]
    return ".".join([ends[0], "", ends[1]]) if any(ends) else "any"


def rows(sensor):
    """What is told of a sensor: tables, each as its heading and its rows."""
    keys = [
        [key["name"], str(key["default"]), range_text(key), key["outOfRange"], key["merged"], key["means"]]
        for key in sensor["keys"]
    ]
    keys += [[key["name"], "", "string", "", "", key["means"]] for key in sensor["stringKeys"]]
    yield ["key", "default", "range", "out of range", "merged to", "means"], keys
    properties = [[f"{entry['id']} {entry['name']}", entry["means"]] for entry in sensor["properties"]]
    yield ["property", "means"], properties or [["none", ""]]
    yield ["field", "means"], [[field["name"], field["means"]] for field in sensor["fields"]]


def notes(sensor):
    found = [f"{key['name']}: {key['note']}" for key in sensor["keys"] if key["note"]]
    return found + ([sensor["note"]] if sensor["note"] else [])


def page(sensors):
    lines = ["# Options", "", HEAD, ""]
    lines += [f"- *{word}*: {means}" for word, means in WORDS]
    for sensor in sensors:
        lines += ["", f"## {sensor['sensor']}: {sensor['title']}"]
        for heading, table in rows(sensor):
            lines += ["", row(heading), row(["---"] * len(heading))]
            lines += [row([f"`{cells[0]}`"] + cells[1:]) for cells in table]
        if notes(sensor):
            lines += [""] + [f"- {note}" for note in notes(sensor)]
    return "\n".join(lines) + "\n"


def row(cells):
    return "| " + " | ".join(cell.replace("*", r"\*") for cell in cells) + " |"


def roff(text):
    text = text.replace("\\", r"\e").replace("-", r"\-").replace("^", r"\(ha").replace("'", r"\(aq")
    return r"\&" + text if text.startswith((".", r"\(aq")) else text


def manual(sensors):
    lines = [
        ".TH SENSELOOM-OPTIONS 7 2026-11-21 senseloom",
        ".SH NAME",
        r"senseloom-options \- option keys, properties and record fields of libsenseloom's sensors",
        ".SH SYNOPSIS",
        r".B senseloom sensors",
        ".RI [ SENSOR ]",
        ".SH DESCRIPTION",
        roff(HEAD.replace("`", "")),
    ]
    for word, means in WORDS:
        lines += [".TP", f".B {roff(word)}", roff(means)]
    for sensor in sensors:
        lines += [f".SH \"{sensor['sensor']}: {sensor['title'].upper()}\""]
        for heading, table in rows(sensor):
            lines += [f".SS {heading[0].capitalize()}"]
            for cells in table:
                lines += [".TP", f".B {roff(cells[0])}", roff(told(heading, cells))]
        for note in notes(sensor):
            lines += [".PP", roff(note)]
    lines += [".SH SEE ALSO", ".BR senseloom (1),", ".BR libsenseloom (3)"]
    return "\n".join(lines) + "\n"


def told(heading, cells):
    """A row as a sentence: what it means, and then the rest."""
    rest = [f"{name}: {cell}" for name, cell in zip(heading[1:-1], cells[1:-1]) if cell]
    return "; ".join([cells[-1]] + rest) + "."


def main():
    tool, source = sys.argv[1], pathlib.Path(sys.argv[2])
    printed = subprocess.run([tool, "sensors", "--json"], check=True, capture_output=True, text=True).stdout
    sensors = [json.loads(line) for line in printed.splitlines()]
    pages = {"docs/options.md": page(sensors), "docs/man/senseloom-options.7": manual(sensors)}
    for name, text in pages.items():
        file = source / name
        if "--write" in sys.argv:
            file.write_text(text)
        if not file.exists() or file.read_text() != text:
            sys.exit(f"{name} is not what is made of `senseloom sensors --json`: {__file__} TOOL SOURCE --write")


main()
