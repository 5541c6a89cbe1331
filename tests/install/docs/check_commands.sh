#!/usr/bin/env bash
# Runs every command of the tool that a page shows, in the order of the page and in a folder like the project's, and
# fails when one does.
set -euo pipefail
tool=$(dirname "$1")
source=$2
folder=$(mktemp -d)
trap 'rm -rf "$folder"' EXIT
export PATH="$tool:$PATH"
ran=0
for page in README.md docs/traces.md examples/README.md; do
  rm -rf "${folder:?}"/*
  mkdir -p "$folder/build/x86"
  cp -r "$source/examples" "$folder"
  ln -s "$tool" "$folder/build/x86/bin"
  while IFS= read -r command; do
    echo "$page: $command"
    (cd "$folder" && bash -c "$command" >"$folder/output" 2>&1 </dev/null) || {
      cat "$folder/output"
      exit 1
    }
    ran=$((ran + 1))
  done < <(sed -n 's/^    \(senseloom .*\)$/\1/p' "$source/$page")
done
[ "$ran" -ge 8 ]
