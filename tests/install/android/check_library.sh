#!/usr/bin/env bash
# Fails unless a loader of API level 21 can load a library on 32-bit x86: check_library.sh LIBRARY IMPORTS
set -euo pipefail
library=$1
imports=$2
dynamic=$(readelf --wide --dynamic "$library")
headers=$(readelf --wide --segments --sections "$library")

failed=0
# require TEXT PATTERN MESSAGE
require() {
  grep -qE "$2" <<<"$1" || { echo "$3"; failed=1; }
}
# forbid TEXT PATTERN MESSAGE
forbid() {
  ! grep -E "$2" <<<"$1" || { echo "$3"; failed=1; }
}
# compare WHAT EXPECTED FOUND
compare() {
  diff --label "$1, expected" --label "$1, found" -u <(sort <<<"$2") <(sort <<<"$3") || failed=1
}

shared=$(grep -vE '^(#|libc\+\+_static)' "$imports")
compare "libraries needed" "$(awk '{print $1 ".so"}' <<<"$shared" | sort -u)" \
  "$(sed -nE 's/.*\(NEEDED\).*\[(.*)\]/\1/p' <<<"$dynamic")"
found=$(nm --dynamic --undefined-only --format=posix "$library" | cut -d' ' -f1)
# A list that has "*" of the C++ run-time says nothing of its names.
if grep -qE '^libc\+\+_static +\*$' "$imports"; then
  found=$(grep -vE '^(_Z|_Unwind_|__gxx_|__divdi3$|__cxa_(allocate|begin|end|free|guard|rethrow|throw))' <<<"$found")
fi
compare "names imported" "$(awk '{for (i = 2; i <= NF; ++i) print $i}' <<<"$shared")" "$found"

require "$dynamic" '\(SONAME\).*\[libsenseloom\.so\]' "the library goes by another name"
require "$dynamic" '\(HASH\)' "loaders before API level 23 find no name without a DT_HASH table"
forbid "$dynamic" 'TEXTREL' "loaders since API level 23 refuse code that is written to at loading"
forbid "$dynamic" 'RPATH|RUNPATH' "a device has no such folder"
forbid "$dynamic" 'RELR|ANDROID_REL' "loaders before API level 23 do not know compressed relocations"
forbid "$headers" ' TLS ' "loaders before API level 29 have no thread-local variables"
forbid "$headers" ' (\.symtab|\.debug_info) ' "the library is not stripped"
! grep -q "never called" "$library" || { echo "the library contains what nobody calls"; failed=1; }

# The instructions that the library consists of, assembled anew for a processor with SSSE3 and nothing above it. The
# numbers are addresses, which do not matter; prefixes on lines of their own are padding.
objdump --disassemble --no-show-raw-insn "$library" |
  sed -nE 's/^ +[0-9a-f]+:\t//; T; s/<.*|#.*//; s/ *$//; s/^((bnd |notrack )?(call|j[a-z]+) +)([0-9a-f]+)$/\10x\4/; p' |
  sort -u >"$library.s"
as --32 -march=core2 "$library.s" -o /dev/null || { echo "instructions above SSSE3"; failed=1; }
exit $failed
