#!/usr/bin/env bash
# Installs the Debian packages of both word sizes side by side into a new system in a folder, uses them there, and
# removes them again: check_in_chroot.sh FOLDER_OF_PACKAGES
set -euo pipefail
packages=$1
sources=$(dirname "$0")/..
root=$(mktemp -d)
trap 'rm -rf --one-file-system "$root"' EXIT

echo "Making a system in $root"
mmdebstrap --quiet --variant=minbase --architectures=amd64,i386 --skip=cleanup/apt/lists bookworm "$root" \
  "deb http://deb.debian.org/debian bookworm main"
mkdir "$root/packages"
cp "$packages"/*.deb "$root/packages"
in_root() { unshare --root="$root" --mount-proc --pid --fork env DEBIAN_FRONTEND=noninteractive LC_ALL=C "$@"; }
echo "Installing the packages"
in_root sh -c "apt-get install -y --no-install-recommends /packages/*.deb" >"$root/log" 2>&1 || { cat "$root/log"; exit 1; }

for word in "amd64 64 x86_64-linux-gnu" "i386 32 i386-linux-gnu"; do
  read -r architecture bits triplet <<<"$word"
  echo "Using the packages of $architecture"
  for package in libsenseloom1 libsenseloom-dev senseloom-recorder; do
    # shellcheck disable=SC2016 # fields of dpkg's
    in_root dpkg-query --show --showformat '${db:Status-Status} ${Package}:${Architecture}\n' "$package:$architecture" |
      grep -qx "installed $package:$architecture"
  done
  gcc "-m$bits" -I "$root/usr/include" -o "$root/embed" "$sources/examples/embed.c" \
    -L "$root/usr/lib/$triplet" -lsenseloom -Wl,--allow-shlib-undefined
  in_root /embed 2>/dev/null | grep -qx "voter: class 3"
  in_root senseloom record -o "/$bits.jsonl" -- /embed >"$root/log" 2>&1 || { cat "$root/log"; exit 1; }
  in_root senseloom replay --check "/$bits.jsonl"
done
in_root senseloom replay --log none --quiet /usr/share/doc/senseloom/examples/audio_classification.jsonl | grep -q LPE_P

echo "Removing the packages"
in_root sh -c "apt-get purge -y '?name(senseloom)'" >"$root/log" 2>&1 || { cat "$root/log"; exit 1; }
left=$(find "$root/usr" "$root/etc" -name '*senseloom*')
[ -z "$left" ] || { echo "left behind: $left"; exit 1; }
echo "The packages of both word sizes work side by side, and leave nothing behind."
