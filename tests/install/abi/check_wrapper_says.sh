#!/usr/bin/env bash
# Fails unless the C++ wrapper, compiled as C++17, is one error that says what it needs: check_wrapper_says.sh WRAPPER COMPILER
set -euo pipefail
said=$("$2" -fsyntax-only -x c++ -std=c++17 "$1" 2>&1) && exit 1
errors=$(grep -E '(^|: )(fatal )?error: ' <<<"$said")
[ "$(wc -l <<<"$errors")" -eq 1 ] && grep -qE "senseloom\.hpp needs C\+\+20: compile with -std=c\+\+20" <<<"$errors" && exit
echo "$said"
exit 1
