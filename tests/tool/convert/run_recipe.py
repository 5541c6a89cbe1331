#!/usr/bin/env python3
"""Runs the program for pandas in docs/viewers.md, and fails unless it prints what the page shows: run_recipe.py TOOL
SOURCE FOLDER
"""
import pathlib
import re
import subprocess
import sys

SKIPPED = 77

tool, source, folder = (pathlib.Path(argument).resolve() for argument in sys.argv[1:])
folder.mkdir(parents=True, exist_ok=True)
pythons = [name for name in (sys.executable, "/usr/bin/python3")
           if subprocess.run([name, "-c", "import pandas"], capture_output=True, check=False).returncode == 0]
if not pythons:
    print("There is no pandas to run the program with.")
    sys.exit(SKIPPED)

page = (source / "docs" / "viewers.md").read_text()
program = re.search(r"^```python\n(.*?)^```$", page, re.S | re.M)[1].replace("/tmp/", f"{folder}/")
shown = re.search(r"^prints\n\n```\n(.*?)^```$", page, re.S | re.M)[1]
subprocess.run([tool, "convert", "--to", "csv", source / "examples" / "commute.jsonl", "-o", folder / "commute.csv"],
               check=True)
printed = subprocess.run([pythons[0], "-c", program], capture_output=True, text=True, check=True).stdout


def plain(text):
    return [line.rstrip() for line in text.splitlines()]


if plain(printed) != plain(shown):
    sys.exit(f"The page shows\n{shown}\nand printed is\n{printed}")
