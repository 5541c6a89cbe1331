#!/usr/bin/python3
"""Prints the tables of docs/accuracy.md: how well what stands in for the platform senses and recognises.

    tests/accuracy/accuracy.py BUILD [FOLDER]

BUILD is the folder of a build. FOLDER has recordings and is laid out like data/, which is the default.
"""

import pathlib
import sys

sys.dont_write_bytecode = True
import digits  # noqa: E402
import sensing  # noqa: E402


def main():
    if len(sys.argv) not in (2, 3):
        sys.exit(f"usage: {sys.argv[0]} BUILD [FOLDER]")
    build = pathlib.Path(sys.argv[1]).resolve()
    folder = pathlib.Path(sys.argv[2]) if len(sys.argv) == 3 else digits.REPOSITORY / "data"
    digits.print_tables(build, folder)
    sensing.print_tables(build, folder)


if __name__ == "__main__":
    main()
