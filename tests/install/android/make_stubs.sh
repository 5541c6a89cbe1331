#!/usr/bin/env bash
# Makes libraries for the linker alone, which have the names of imports.txt and no others:
# make_stubs.sh CLANG AR IMPORTS FOLDER
set -euo pipefail
clang=("$1" --target=i686-linux-android21 -nostdlib)
ar=$2
imports=$3
cd "$4"

# names LIBRARY: assembles each name in a section of its own, as the NDK's archives are compiled.
names() {
  awk -v library="$1" '$1 == library && $2 != "*" {
    for (i = 2; i <= NF; ++i) printf ".section .text.%s,\"ax\",@progbits\n.globl %s\n%s: .long 0\n", $i, $i, $i
  }' "$imports"
}

awk '!/^(#|$|libc\+\+_static|libhardware|libgesture|libsenseloom)/ {print $1}' "$imports" | sort -u | while read -r library; do
  names "$library" | "${clang[@]}" -shared -fuse-ld=lld "-Wl,-soname,$library.so" -x assembler - -o "$library.so"
done
# Code that nobody calls, as most of an archive is.
{
  names libc++_static
  echo '.section .text.unused,"ax",@progbits; .globl unused; unused: .ascii "never called"'
} | "${clang[@]}" -c -x assembler - -o runtime.o
rm -f libc++_static.a
"$ar" qc libc++_static.a runtime.o
