#!/usr/bin/env bash
# Links the objects for Android with the host's libraries, and runs a program that takes the library:
# check_stack_offsets.sh CXX OBJECTS VERSION_SCRIPT JANSSON PROGRAM OUTPUT
set -euo pipefail
mapfile -t objects < <(find "$2" -name '*.o')
# g++'s library lacks two names of LLVM's, for errors that do not occur.
missing=_ZNSt20bad_array_new_lengthC1Ev=0,--defsym=_ZTVSt18bad_variant_access=0
"$1" -m32 -shared "${objects[@]}" -Wl,--version-script="$3" -Wl,--defsym=$missing "$4" -o "$6"
"$5" "$6"
