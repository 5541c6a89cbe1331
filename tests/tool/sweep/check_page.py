#!/usr/bin/env python3
"""Runs the commands of docs/choosing-options.md in a folder with the project's data and examples, and fails unless each
prints what the page shows below it. With --write, the page and its picture get what was printed.

check_page.py TOOL SOURCE FOLDER [--write]
"""
import os
import pathlib
import shutil
import subprocess
import sys

COMMANDS = ("senseloom ", "awk ", "sed ")


def blocks(lines):
    """The indented blocks, as (first line, line behind the last)."""
    start = None
    for number, line in enumerate(lines + [""]):
        if line.startswith("    ") and start is None:
            start = number
        elif not line.startswith("    ") and start is not None:
            yield start, number
            start = None


def run(command, folder, tool):
    environment = dict(os.environ, PATH=f"{tool.parent}:{os.environ['PATH']}")
    done = subprocess.run(["bash", "-c", command], cwd=folder, env=environment, capture_output=True, text=True)
    if done.returncode != 0:
        sys.exit(f"{command}\nends with status {done.returncode}:\n{done.stderr}")
    return ["    " + line for line in done.stdout.splitlines()]


def main():
    tool, source, folder = (pathlib.Path(argument).resolve() for argument in sys.argv[1:4])
    page = source / "docs" / "choosing-options.md"
    picture = source / "docs" / "choosing-options.svg"
    shutil.rmtree(folder, ignore_errors=True)
    folder.mkdir(parents=True)
    for shared in ("data", "examples"):
        (folder / shared).symlink_to(source / shared)

    lines = page.read_text().splitlines()
    made = []
    copied = ran = 0
    for start, end in blocks(lines):
        made += lines[copied:start]
        copied = start
        commands = [line for line in lines[start:end] if line.strip().startswith(COMMANDS)]
        if commands:
            for command in commands:
                made.append(command)
                made += run(command.strip(), folder, tool)
                ran += 1
            copied = end
    made += lines[copied:]

    drawn = (folder / picture.name).read_text()
    if "--write" in sys.argv:
        page.write_text("\n".join(made) + "\n")
        picture.write_text(drawn)
    if made != lines:
        for here, there in zip(made, lines):
            if here != there:
                sys.exit(f"{page.name} shows\n{there}\nand printed is\n{here}")
        sys.exit(f"{page.name} does not show all that is printed")
    if drawn != picture.read_text():
        sys.exit(f"{picture.name} is another picture")
    if ran < 8:
        sys.exit("too few commands were found")


main()
