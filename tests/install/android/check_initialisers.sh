#!/usr/bin/env bash
# Fails when a library, or the objects below a folder, do not have that many initialisers to run at loading, in sum:
# check_initialisers.sh READELF COUNT LIBRARY|FOLDER
set -euo pipefail
mapfile -t files < <(if [ -d "$3" ]; then find "$3" -name '*.o'; else echo "$3"; fi)
found=0
for file in "${files[@]}"; do
  bits=$("$1" --file-header "$file" | sed -nE 's/^ *Class: +ELF//p')
  bytes=$("$1" --section-headers --wide "$file" | sed -nE 's/.* INIT_ARRAY +[0-9a-f]+ [0-9a-f]+ ([0-9a-f]+) .*/0x\1/p')
  [ -z "$bytes" ] || echo "$file has $((bytes * 8 / bits))"
  found=$((found + bytes * 8 / bits))
done
[ "$found" -eq "$2" ] || { echo "$found initialisers in ${#files[@]} files, expected $2"; exit 1; }
