#!/usr/bin/env bash
# Writes down the interface of the 32-bit library as it is built now, after a change that was meant.
set -euo pipefail
cd "$(dirname "$0")/../../.."
cmake --preset x86 -DBUILD_TESTING=ON >/dev/null
cmake --build --preset x86 --target senseloom senseloom_abi >/dev/null
abidw --headers-dir include --drop-private-types --exported-interfaces-only --no-show-locs --no-corpus-path \
  --no-comp-dir-path --out-file tests/install/abi/libsenseloom.abi build/x86/tests/install/abi/libsenseloom.so
sed -i "s|path='$PWD/|path='|" tests/install/abi/libsenseloom.abi
tests/install/abi/check_exports.sh nm build/x86/lib/libsenseloom.so /dev/null | sed -n 's/^> //p' >tests/install/abi/exports.txt
git diff --stat -- tests/install/abi
