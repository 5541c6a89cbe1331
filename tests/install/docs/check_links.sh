#!/usr/bin/env bash
# Fails when a page links to a file that is not there.
set -euo pipefail
cd "$1"
missing=0
for page in *.md docs/*.md examples/*.md platform/*.md bench/*.md; do
  while IFS= read -r target; do
    [ -e "$(dirname "$page")/$target" ] || { echo "$page: no $target"; missing=1; }
  done < <(grep -oE '\]\([^)#:]+\)' "$page" | sed 's/^](//; s/)$//')
done
exit $missing
