#!/usr/bin/env python3
"""Adds the sensor of docs/adding-a-sensor.md to a copy of the sources and uses it: follow.py ROOT BUILD OUTPUT"""

import os
import pathlib
import shutil
import subprocess
import sys

from page import apply
from rebuild import CompileError, Rebuild

FOLDERS = ["fuzz", "include", "model", "platform", "src", "tests", "tools"]

SENSOR = """\
SPIN: spin
  key        default  range  out of range  merged to   means
  classMask  15       1..15  becomes 15    bitwise or  the directions wanted, bit i for class i + 1
  speed      0        0..9   becomes 0     minimum     the least speed of a spin, in turns a second
  property       means
  221 classMask  "classMask", merged
  222 speed      "speed", merged
  field      means
  timestamp  any number, such as a time in any unit: it is copied or compared, and never interpreted
  class      a class number from 1; what it stands for is defined by whoever makes the records
"""
RECEIVED = """\
  line  call        session   sensor  return  outcome
     1  note                                  Class 3 is bit 2 of the mask, so the first of the two clients does not get it.
     2  open        left      SPIN    handle
     3  set_option  left      SPIN    0       {"classMask":3,"speed":7} -> 221 classMask=3, 222 speed=7
     4  open        all       SPIN    handle
     5  set_option  all       SPIN    0       {"classMask":15,"speed":4} -> 221 classMask=15, 222 speed=4
     6  dispatch    left      SPIN    0       timestamp=1 class=3
     7  dispatch    all       SPIN    1       timestamp=1 class=3 -> the record
     8  close       all       SPIN    1       221 classMask=3, 222 speed=7
     9  close       left      SPIN    0
"""


def expect(what, holds, text):
    if not holds:
        sys.exit(f"{what}:\n{text}")


def run(program, *arguments):
    done = subprocess.run([program, *arguments], capture_output=True, text=True)
    expect(f"{program} {' '.join(arguments)} failed", done.returncode == 0, done.stdout + done.stderr)
    return done.stdout


def use(tool, cases, picture):
    """Runs every command of the tool that knows the sensor."""
    shown = run(tool, "sensors", "SPIN")
    expect("sensors prints something else", shown == SENSOR, shown)
    received = run(tool, "replay", "--all", "--plot", picture, cases)
    expect("replay prints something else", received == RECEIVED, received)
    drawn = pathlib.Path(picture).read_text()
    expect("the picture does not show the class", "SPIN" in drawn and "class 3" in drawn, drawn)
    reasons = run(tool, "explain", "SPIN", '{"speed":7}', '{"speed":4,"classMask":16}')
    expect("explain does not know who decided", "minimum" in reasons and "unexplained" not in reasons, reasons)
    reasons = run(tool, "explain", "--records", cases)
    expect("explain does not know why", "class not wanted: bits 4, mask 3" in reasons and "unexplained" not in reasons, reasons)


def forget_row(table, compile_table):
    """Without its row in the tool's table, the sensor is an error that names it."""
    rows = table.read_text().splitlines(keepends=True)
    table.write_text("".join(row for row in rows if "SPIN" not in row))
    try:
        compile_table()
    except CompileError as error:
        expect("the compiler does not name the sensor", "ContextSensorSpin has no row in kSensors" in str(error), str(error))
    else:
        sys.exit("a sensor without its row compiles")


def main():
    root, build, output = (os.path.abspath(argument) for argument in sys.argv[1:])
    shutil.rmtree(output, ignore_errors=True)
    tree = os.path.join(output, "tree")
    for folder in FOLDERS:
        shutil.copytree(os.path.join(root, folder), os.path.join(tree, folder))
    changed = apply(pathlib.Path(root, "docs/adding-a-sensor.md").read_text(), tree)
    cases = os.path.join(tree, "tests/cases/spin.jsonl")
    rebuild = Rebuild(build, root, tree, changed, os.path.join(output, "build"))
    tool = rebuild.target("senseloom_cli")
    os.environ["LD_LIBRARY_PATH"] = f"{output}/build/lib:{build}/lib"
    use(tool, cases, os.path.join(output, "spin.svg"))
    run(rebuild.target("case_runner"), cases)
    run(rebuild.target("unit_test"), "--gtest_filter=*Contract*")
    run(rebuild.target("allocation_failure_test"), "--gtest_filter=*/SPIN")

    table = pathlib.Path(tree, "tools/senseloom/kinds/sensor_table.cpp")
    without_row = Rebuild(build, root, tree, [table], os.path.join(output, "build_without_row"))
    forget_row(table, lambda: without_row.target("senseloom_cli"))


main()
