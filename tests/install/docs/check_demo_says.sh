#!/usr/bin/env bash
# Fails unless `make demo` says what it does before it begins to build: check_demo_says.sh SOURCE
set -euo pipefail
unset MAKEFLAGS MAKELEVEL # of a make that runs this
folder=$(mktemp -d)
trap 'rm -rf "$folder"' EXIT
mkdir -p "$folder/scripts" "$folder/stand_in"
cp "$1/Makefile" "$folder"
program() { { echo "#!/bin/sh" && echo "$2"; } >"$folder/$1" && chmod +x "$folder/$1"; }
program scripts/install-deps.sh ""
program scripts/host-presets.sh "echo x86"
program stand_in/cmake "echo the build fails; exit 1"
said=$(PATH=$folder/stand_in:$PATH make -C "$folder" --no-print-directory demo 2>&1) && exit 1
diff <(head -n 2 <<<"$said") - <<'END'
Building in build/x86, which can take some minutes; build/x86.log shows how far it is.
the build fails
END
