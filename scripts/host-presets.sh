#!/usr/bin/env bash
# Prints which of the given presets this host can build: without a 32-bit toolchain those for x86 are left out.
set -euo pipefail
if echo 'int main() {}' | g++ -m32 -x c++ - -o /dev/null 2>/dev/null; then
  echo "$@"
else
  echo "This host cannot build 32-bit x86 programs: leaving that out." >&2
  for preset in "$@"; do
    case $preset in *x86) ;; *) echo "$preset" ;; esac
  done
fi
