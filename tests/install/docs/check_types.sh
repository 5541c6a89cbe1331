#!/usr/bin/env bash
# Fails unless the types that the page about loading gives for functions are those of the header: check_types.sh SOURCE CC
set -euo pipefail
assertion='_Static_assert(__builtin_types_compatible_p(__typeof__(\&\1), \2), "\1");'
types=$(sed -nE "s/^\| \`([a-z_]+)\` \| \`(.*)\` \|\$/$assertion/p" "$1/docs/loading.md")
[ "$(wc -l <<<"$types")" -ge 6 ]
"$2" -fsyntax-only -I "$1/include" -x c - <<<"#include <senseloom.h>
$types"
