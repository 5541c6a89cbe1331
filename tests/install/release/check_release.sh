#!/usr/bin/env bash
# Tries `make release` in a small project of its own: check_release.sh SOURCE TEST
set -euo pipefail
unset MAKEFLAGS MAKELEVEL # of a make that runs this
project=$(mktemp -d)
trap 'rm -rf "$project"' EXIT
export GIT_CONFIG_GLOBAL=/dev/null GIT_CONFIG_SYSTEM=/dev/null
export GIT_AUTHOR_NAME=a GIT_AUTHOR_EMAIL=a@example GIT_COMMITTER_NAME=a GIT_COMMITTER_EMAIL=a@example
mkdir "$project/scripts" "$project/include"
cp "$1/Makefile" "$1/.gitignore" "$project"
cp "$1/scripts/release.sh" "$project/scripts"
cd "$project"
printf '#define SENSELOOM_VERSION_%s\n' "MAJOR 2" "MINOR 5 /**< . */" "PATCH 1" >include/senseloom.h
# Stands in for make: `passes` is the status of what it makes.
cat >passes <<'END'
#!/bin/sh
mkdir -p build/packages && touch build/packages/senseloom_2.5.1_amd64.deb build/packages/senseloom_2.5.0_amd64.deb
[ "$*" = "test sanitize lint check-packages" ]
END
printf '#!/bin/sh\nexit 1\n' >fails
chmod +x passes fails
notes() { printf '# Changelog\n\n## %s\n\n- News.\n\n## 2.5.0, 2026-01-01\n\n- Old.\n' "$1" >CHANGELOG.md; }
notes "2.5.1, 2026-02-03"
git init -q
commit() { git add . && git commit -qm "$1"; }
commit "A project"
release() { make --no-print-directory "MAKE=./${1:-passes}" release 2>&1; }
refused() {
  said=$(release "${2:-passes}") && { echo "released: $said"; exit 1; }
  grep -qF -- "No release: $1" <<<"$said" || { echo "$said"; exit 1; }
}

case $2 in
  TagsWhatPassesAndPutsItsFilesTogether)
    release
    diff <(git tag --list --format='%(objecttype) %(refname) %(contents)') - <<<$'tag refs/tags/v2.5.1 senseloom 2.5.1\n\n- News.\n'
    diff <(ls build/release/2.5.1) - <<<$'NOTES.md\nSHA256SUMS\nsenseloom-2.5.1.tar.gz\nsenseloom_2.5.1_amd64.deb'
    tar -tf build/release/2.5.1/senseloom-2.5.1.tar.gz | grep -x senseloom-2.5.1/CHANGELOG.md >/dev/null # which reads all
    (cd build/release/2.5.1 && sha256sum --quiet --check SHA256SUMS)
    exit
    ;;
  RefusesATreeWithChanges)
    touch new
    refused "the tree has changes that are not committed"
    ;;
  RefusesAVersionWithoutNotes)
    notes "2.5.1, not yet released"
    commit "No date"
    refused 'the first heading in CHANGELOG.md is "## 2.5.1, not yet released"'
    notes "2.5.0, 2026-02-03"
    commit "Another version"
    refused 'the first heading in CHANGELOG.md is "## 2.5.0, 2026-02-03"'
    printf '## 2.5.1, 2026-02-03\n\n## 2.5.0, 2026-01-01\n\n- Old.\n' >CHANGELOG.md
    commit "Nothing new"
    refused "CHANGELOG.md says nothing about 2.5.1"
    ;;
  RefusesAVersionThatThereIs)
    git tag v2.5.1
    refused "there is a v2.5.1 already"
    exit
    ;;
  RefusesWhatFailsATest) refused "a test failed" fails ;;
esac
[ -z "$(git tag)" ]
