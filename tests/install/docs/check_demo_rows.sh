#!/usr/bin/env bash
# Fails unless the demo prints each row that the README shows of it.
set -euo pipefail
tool=$1
source=$2
printed=$("$source/scripts/demo.sh" "$tool" 2>&1)
# shellcheck disable=SC2016 # backquotes of the page
shown=$(sed -n '/^### What `make demo` prints/,/^Each row/s/^    //p' "$source/README.md")
[ "$(wc -l <<<"$shown")" -ge 3 ]
while IFS= read -r row; do
  grep -qF -- "${row#"${row%%[![:space:]]*}"}" <<<"$printed" || { echo "not printed: $row"; exit 1; }
done <<<"$shown"
