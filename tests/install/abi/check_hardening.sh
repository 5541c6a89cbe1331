#!/usr/bin/env bash
# check_hardening.sh READELF LIBRARY: what keeps a mistake in the library from becoming more than one.
set -euo pipefail
readelf=$1
library=$2
segments=$("$readelf" --wide --program-headers "$library")
dynamic=$("$readelf" --wide --dynamic "$library")
symbols=$("$readelf" --wide --dyn-syms "$library" | awk '$7 == "UND" {print $8}')

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
require "$symbols" '^__stack_chk_fail' "functions with arrays do not guard their stack frames"
# With _FORTIFY_SOURCE those that write to memory of known size are the __..._chk ones.
forbid "$symbols" '^(strcpy|stpcpy|strcat|strncat|sprintf|vsprintf|snprintf|vsnprintf|gets|fgets|read|recv)(@|$)' \
  "functions that write without a check"
exit $failed
