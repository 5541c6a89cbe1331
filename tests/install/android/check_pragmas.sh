#!/usr/bin/env bash
# Fails when a compiler that does not know a pragma would see it: clang before 13 does not know "#pragma GCC unroll".
# check_pragmas.sh CLANG ROOT
set -euo pipefail
clang=$1
cd "$2"

# unrolled FLAGS...: the pragma's lines in all sources that have it, as the compiler sees them.
unrolled() {
  grep -rl unroll src | while read -r source; do
    "$clang" -std=c++20 -Isrc -Iinclude -E "$@" "$source" | grep -E 'pragma .*unroll' || true
  done
}
[ -n "$(unrolled)" ] || { echo "no compiler sees the pragma"; exit 1; }
found=$(unrolled -D__clang_major__=12 -Wno-macro-redefined)
[ -z "$found" ] || { echo "clang 12 sees: $found"; exit 1; }
