#!/usr/bin/env bash
# Installs what building, testing or another task needs and the machine lacks, from Debian's packages. Prints nothing
# when nothing is missing.
#
#   scripts/install-deps.sh [TASK...]    tasks: build (the default), test, packages, bench, fuzz, coverage, lint
set -euo pipefail

# Per task: packages that are programs or headers, and libraries, which 32-bit x86 needs in its own version, too.
declare -A programs=(
  [build]="g++ cmake ninja-build libcli11-dev zlib1g-dev"
  [test]="abigail-tools binutils chromium chromium-driver clang clang-13 doxygen dpkg-dev file fish fonts-dejavu-core groff-base libc++-dev libc++abi-dev librsvg2-bin lintian lld locales pkg-config python3 python3-jsonschema python3-numpy python3-pandas valgrind zsh"
  [packages]="dpkg-dev lintian mmdebstrap python3"
  [bench]="libboost-dev librange-v3-dev"
  [fuzz]="clang libclang-rt-14-dev" # brings the runtime libraries of both word sizes
  [coverage]="clang libclang-rt-14-dev llvm"
  [lint]="clang-format clang-tidy codespell cppcheck shellcheck"
)
declare -A libraries=(
  [build]="libjansson-dev android-liblog-dev libzstd-dev zlib1g"
  [test]="libc6-dbg libgtest-dev"
  [packages]=""
  [bench]="libbenchmark-dev libsigc++-2.0-dev"
  [fuzz]=""
  [coverage]=""
  [lint]=""
)

[ $# -gt 0 ] || set -- build
host=$(dpkg --print-architecture)
wanted=()
for task in "$@"; do
  read -ra more <<<"${programs[$task]}"
  wanted+=("${more[@]}")
  read -ra more <<<"${libraries[$task]}"
  if [ ${#more[@]} -gt 0 ]; then wanted+=("${more[@]/%/:$host}"); fi
  if [ "$host" = amd64 ] && [ ${#more[@]} -gt 0 ]; then wanted+=(g++-multilib "${more[@]/%/:i386}"); fi
done
# Where npm is there already, it may be a part of another package.
if [[ " $* " == *" lint "* ]] && ! command -v npm >/dev/null; then wanted+=(npm); fi

installed=$(dpkg-query --show --showformat '${Package} ${Status}\n${Package}:${Architecture} ${Status}\n' |
  sed -n 's/ install ok installed$//p')
missing=$(printf '%s\n' "${wanted[@]}" | sort -u | grep -vxF -f <(printf '%s\n' "$installed") || true)
[ -n "$missing" ] || exit 0

echo "Installing $(tr '\n' ' ' <<<"$missing")"
if [ "$(id -u)" -ne 0 ]; then
  echo "Installing packages takes root: run '$0 $*' as root once." >&2
  exit 1
fi
export DEBIAN_FRONTEND=noninteractive
log=$(mktemp)
trap 'rm -f "$log"' EXIT
if [ "$host" = amd64 ]; then dpkg --add-architecture i386; fi
# An index that cannot be fetched may well not be one that is needed: the installation decides.
apt-get update >"$log" 2>&1 || true
# shellcheck disable=SC2086 # one word a package
if ! apt-get install -y --no-install-recommends --no-remove $missing >>"$log" 2>&1; then
  cat "$log" >&2
  exit 1
fi
