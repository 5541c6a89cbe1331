#!/usr/bin/env bash
# Compares what a library exports with a list of names, and with more of them: check_exports.sh NM LIBRARY LIST [NAME...]
set -euo pipefail
export LC_ALL=C
"$1" --dynamic --defined-only --format=posix "$2" | cut -d' ' -f1,2 | sort |
  diff <({ cat "$3" && printf '%s\n' "${@:4}"; } | sed '/^$/d' | sort) -
