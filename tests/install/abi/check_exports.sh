#!/usr/bin/env bash
# Compares what a library exports with a list of names: check_exports.sh NM LIBRARY LIST
set -euo pipefail
"$1" --dynamic --defined-only --format=posix "$2" | cut -d' ' -f1,2 | LC_ALL=C sort | diff "$3" -
