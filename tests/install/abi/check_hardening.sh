#!/usr/bin/env bash
# What keeps a mistake in the library from becoming more than one: check_hardening.sh READELF LIBRARY FOLDER
#
# FOLDER: of the objects that the library was linked from.
set -euo pipefail
readelf=$1
library=$2
mapfile -t objects < <(find "$3" -name '*.o')
segments=$("$readelf" --wide --program-headers "$library")
dynamic=$("$readelf" --wide --dynamic "$library")
imports=$("$readelf" --wide --dyn-syms "$library" | awk '$7 == "UND" {print $8}')
used=$("$readelf" --wide --symbols "${objects[@]}" | awk '$7 == "UND" {print $8}')

failed=0
# require TEXT PATTERN MESSAGE
require() {
  if ! grep -qE "$2" <<<"$1"; then
    echo "$3"
    failed=1
  fi
}
# forbid TEXT PATTERN MESSAGE
forbid() {
  if grep -E "$2" <<<"$1"; then
    echo "$3"
    failed=1
  fi
}
# Full RELRO: tables that hold addresses of functions are resolved and made read-only at loading.
require "$segments" 'GNU_RELRO' "the tables of addresses stay writable"
require "$dynamic" 'BIND_NOW|Flags:.* NOW' "functions are looked up when they are first called"
forbid "$dynamic" 'TEXTREL' "the code is written to at loading"
require "$segments" 'GNU_STACK .* RW  ' "the stack can be executed"
forbid "$segments" 'LOAD .* RWE ' "memory can be written and executed"
require "$imports" '^__stack_chk_fail' "functions with arrays do not guard their stack frames"
# With _FORTIFY_SOURCE those that write to memory of known size are the __..._chk ones. What archives bring into the
# library was compiled by others, so the library's own objects are looked at.
forbid "$used" '^(strcpy|stpcpy|strcat|strncat|sprintf|vsprintf|snprintf|vsnprintf|gets|fgets|read|recv)(@|$)' \
  "functions that write without a check"
exit $failed
