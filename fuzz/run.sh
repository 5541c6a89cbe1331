#!/usr/bin/env bash
# Lets each fuzz target run for SECONDS, in a build folder that has them (CMake's SENSELOOM_FUZZ). Starts from the corpus
# and adds new inputs to the build folder, where an input that fails is left, too.
set -euo pipefail

if [ $# -ne 2 ]; then
  echo "usage: $0 SECONDS BUILD_FOLDER" >&2
  exit 2
fi
seconds=$1
programs=$2/fuzz
sources=$(cd "$(dirname "$0")" && pwd)

for target in options records sequences gesture hub; do
  echo "== $target"
  mkdir -p "$programs/found/$target"
  "$programs/fuzz_$target" -max_total_time="$seconds" -max_len=4096 -timeout=10 -print_final_stats=1 \
    -dict="$sources/senseloom.dict" -artifact_prefix="$programs/failing-$target-" \
    "$programs/found/$target" "$sources/corpus/$target"
done
