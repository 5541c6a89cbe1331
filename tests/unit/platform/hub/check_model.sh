#!/usr/bin/env bash
# Fails unless the limits of the activity classifier are what the script learns from the recordings in the repository.
set -euo pipefail

model=$1/platform/hub/activity_model.inc
# numpy is a package of Debian's Python.
/usr/bin/python3 -B "$1/scripts/learn_activity.py" | diff - "$model" >/dev/null || {
  echo "$model is not what scripts/learn_activity.py prints" >&2
  exit 1
}
