#!/usr/bin/env bash
# Makes a release of what is committed: packages that passed the tests, sources, notes and a tag. Publishes nothing.
#
#   scripts/release.sh [MAKE]    MAKE: the program that makes the Makefile's targets
set -euo pipefail
cd "$(dirname "$0")/.."
refuse() {
  echo "No release: $1." >&2
  exit 1
}

version=$(sed -nE 's/^#define SENSELOOM_VERSION_(MAJOR|MINOR|PATCH) ([0-9]+).*/\2/p' include/senseloom.h | paste -sd .)
check_tree() { [ -z "$(git status --porcelain)" ] || refuse "the tree has changes that are not committed"; }
check_tree
if git rev-parse --quiet --verify "refs/tags/v$version" >/dev/null; then
  refuse "there is a v$version already: raise the version in include/senseloom.h"
fi
heading=$(grep -m 1 '^## ' CHANGELOG.md)
[[ $heading =~ ^"## $version, "[0-9]{4}-[0-9]{2}-[0-9]{2}$ ]] ||
  refuse "the first heading in CHANGELOG.md is \"$heading\", and not \"## $version, $(date +%F)\""
notes=$(awk '/^## / { ++sections; next } sections == 1' CHANGELOG.md)
grep -q '^- ' <<<"$notes" || refuse "CHANGELOG.md says nothing about $version"

commit=$(git rev-parse HEAD)
"${1:-make}" test sanitize lint check-packages || refuse "a test failed"
check_tree
[ "$(git rev-parse HEAD)" = "$commit" ] || refuse "another commit was checked out meanwhile"

release=build/release/$version
rm -rf "$release"
mkdir -p "$release"
cp build/packages/*_"$version"_*.deb "$release"
git archive --prefix "senseloom-$version/" --output "$release/senseloom-$version.tar.gz" HEAD
printf 'senseloom %s\n%s\n' "$version" "$notes" >"$release/NOTES.md"
(cd "$release" && sha256sum -- *.deb *.tar.gz >SHA256SUMS)
git tag --annotate "v$version" --cleanup=verbatim --file "$release/NOTES.md"
echo "Tagged v$version. To publish it: git push origin v$version, with the files in $release."
