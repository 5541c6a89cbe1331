#!/usr/bin/env bash
# Fails when a manual page is formatted with a warning or lacks a section, or when an exported function has no page:
# check_manual.sh MANDIR EXPORTS
set -euo pipefail
for page in "$1"/man*/*; do
  if grep -q '^\.so ' "$page"; then continue; fi # it leads to another
  warnings=$(groff -ww -man -Tutf8 -z "$page" 2>&1)
  [ -z "$warnings" ] || { echo "$warnings"; exit 1; }
  for section in NAME SYNOPSIS DESCRIPTION "SEE ALSO"; do
    grep -qE "^\.SH \"?$section\"?$" "$page" || { echo "$page has no section $section"; exit 1; }
  done
done
while read -r function; do
  grep -qx '\.so man3/libsenseloom\.3' "$1/man3/$function.3" || { echo "no page leads from $function"; exit 1; }
  grep -qxE "$function,?" "$1/man3/libsenseloom.3" || { echo "libsenseloom(3) does not name $function"; exit 1; }
done < <(sed -n 's/ T$//p' "$2")
