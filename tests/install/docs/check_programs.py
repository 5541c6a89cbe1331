#!/usr/bin/env python3
"""Fails unless each program in examples/ stands on a page, letter for letter: check_programs.py SOURCE"""
import pathlib
import re
import sys

source = pathlib.Path(sys.argv[1])
pages = "".join(page.read_text() for page in [source / "README.md", *source.glob("docs/*.md")])
shown = dict(re.findall(r"This is `examples/(\w+\.c)`.*?:\n\n```c\n(.*?)```", pages, re.S))
wrong = [program.name for program in source.glob("examples/*.c") if shown.get(program.name) != program.read_text()]
sys.exit(f"no page shows {', '.join(wrong)}" if wrong else 0)
