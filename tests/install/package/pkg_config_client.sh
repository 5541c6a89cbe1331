#!/usr/bin/env bash
# Builds a program with what pkg-config says about an installed library, and runs it:
# pkg_config_client.sh LIBDIR PROGRAM COMPILER [FLAG...] SOURCE
set -euo pipefail
libdir=$1
program=$2
shift 2
export PKG_CONFIG_PATH=$libdir/pkgconfig
read -ra flags <<<"$(pkg-config --cflags --libs senseloom)"
"$@" "${flags[@]}" -o "$program"
LD_LIBRARY_PATH=$libdir "$program"
