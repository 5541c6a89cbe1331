#!/usr/bin/env bash
# Fails when a build that is configured without a preset would stop at a warning, or is not optimised:
# check_plain_build.sh CMAKE SOURCE FOLDER
set -euo pipefail
rm -rf "$3"
env -u CMAKE_BUILD_TYPE "$1" -G Ninja -S "$2" -B "$3" -D BUILD_TESTING=OFF >"$3.log" 2>&1 || { cat "$3.log"; exit 1; }
if grep -o -e '-Werror[^ ]*' "$3/compile_commands.json"; then exit 1; fi
grep -q -e ' -O3 ' "$3/compile_commands.json"
