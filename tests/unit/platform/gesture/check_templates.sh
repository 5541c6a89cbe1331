#!/usr/bin/env bash
# Fails unless the gesture engine's templates are what the script learns from the drawings in the repository, in at most
# 64 KiB.
set -euo pipefail

templates=$1/platform/libgesture/templates.inc
# numpy is a package of Debian's Python.
/usr/bin/python3 -B "$1/scripts/learn_digits.py" | diff - "$templates" >/dev/null || {
  echo "$templates is not what scripts/learn_digits.py prints" >&2
  exit 1
}
[ "$(stat --format %s "$templates")" -le 65536 ]
