#!/usr/bin/env bash
# Makes the Debian packages of a build and compares what they hold and depend on with what they should:
# check_debs.sh CPACK BUILD OUTPUT TRIPLET
set -euo pipefail
triplet=$4
rm -rf "$3"
mkdir -p "$3"
(cd "$2" && "$1" -G DEB -B "$3" >"$3/log" 2>&1) || { cat "$3/log"; exit 1; }

case $triplet in
  i386-*) architecture=i386 ;;
  *) architecture=$(dpkg --print-architecture) ;;
esac
for package in libsenseloom1 libsenseloom-dev senseloom; do
  deb=$(echo "$3/${package}"_*_"$architecture".deb)
  [ "$(dpkg-deb --field "$deb" Architecture)" = "$architecture" ]
  echo "$package: $(dpkg-deb --field "$deb" Depends | sed 's/ ([^)]*)//g')"
  dpkg-deb --contents "$deb" | awk '$1 !~ /^d/ { print $6, $7, $8 }' | sed 's/ *$//' |
    grep -v -e '/docs/' -e '/examples/' | LC_ALL=C sort
done >"$3/contents"
sed "s/TRIPLET/$triplet/g" "$(dirname "$0")/debs.txt" | diff - "$3/contents"
