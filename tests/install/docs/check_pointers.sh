#!/usr/bin/env bash
# Fails when the page about pointers leaves out a name that the library exports: check_pointers.sh PAGE EXPORTS
set -euo pipefail
missing=0
while read -r name _; do
  grep -qF "\`$name\`" "$1" || { echo "$1 does not tell about $name"; missing=1; }
done <"$2"
exit $missing
