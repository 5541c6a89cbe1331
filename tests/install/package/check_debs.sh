#!/usr/bin/env bash
# Compares what the Debian packages hold and depend on with what they should: check_debs.sh PACKAGES TRIPLET VERSION
set -euo pipefail
triplet=$2
version=$3
architecture=$(dpkg --print-architecture)
contents=$(
  for package in libsenseloom1 libsenseloom-dev senseloom-recorder senseloom; do
    deb=$1/${package}_${version}_$architecture.deb
    field() { dpkg-deb --field "$deb" "$1" | sed 's/ ([^)]*)//g'; }
    echo "$package, multi-arch $(field Multi-Arch): $(field Depends)"
    dpkg-deb --contents "$deb" | awk '$1 !~ /^d/ { print $6, $7, $8 }' | sed 's/ *$//' |
      grep -v -e '/docs/' -e '/examples/' | LC_ALL=C sort
  done
)
sed "s/TRIPLET/$triplet/g; s/VERSION/$version/g" "$(dirname "$0")/debs.txt" | diff - <(echo "$contents")
