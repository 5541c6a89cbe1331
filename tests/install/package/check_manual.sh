#!/usr/bin/env bash
# Fails when a manual page is formatted with a warning or lacks a section: check_manual.sh MANDIR
set -euo pipefail
for page in "$1"/man*/*; do
  warnings=$(groff -ww -man -Tutf8 -z "$page" 2>&1)
  [ -z "$warnings" ] || { echo "$warnings"; exit 1; }
  for section in NAME SYNOPSIS DESCRIPTION "SEE ALSO"; do
    grep -qE "^\.SH \"?$section\"?$" "$page" || { echo "$page has no section $section"; exit 1; }
  done
done
