#!/usr/bin/env bash
# Checks the style of everything, and the library's sources for mistakes that tools can see. Takes a build folder, for
# the commands that its files are compiled by.
set -euo pipefail
cd "$(dirname "$0")/.."
build=$1
mapfile -t cpp < <(git ls-files '*.cpp' '*.h' '*.hpp' '*.c' ':!include/senseloom.h' ':!tests/install/android/sysroot')
mapfile -t scripts < <(git ls-files '*.sh' .ci/run)
mapfile -t library < <(git ls-files 'src/*.cpp')

clang-format --dry-run --Werror "${cpp[@]}"
printf '%s\0' "${library[@]}" | xargs -0 -n 1 -P "$(nproc)" clang-tidy -p "$build" --quiet 2>/dev/null
# cppcheck 2.10 takes the pointers of an array for integers.
cppcheck --quiet --error-exitcode=1 --std=c++20 --language=c++ --enable=warning,performance,portability \
  --suppress=CastIntegerToAddressAtReturn:src/registry/registry.cpp -I include -I src "${library[@]}"
# "opton" is a text of the library, letter for letter; some tests mistype on purpose.
codespell --ignore-words-list=opton,inout,stap,allone,comute,fo,inforce,levle,onlyonce,opne --skip='./build,./.git,./fuzz/corpus,*.svg,./docs/commute.html,package-lock.json,*.jsonl,LICENSE,*templates.inc' .
shellcheck "${scripts[@]}"
# The page's JavaScript. Its checker comes from npm, in the versions that are pinned, and stays in the build folder.
mkdir -p "$build/eslint"
rm -rf "$build/eslint/page"
cp -r tools/senseloom/view/lint/. tools/senseloom/view/page "$build/eslint"
(
  cd "$build/eslint"
  [ node_modules -nt package-lock.json ] || npm ci --ignore-scripts --no-audit --no-fund --loglevel=error
  npx eslint page
)
echo "lint: clean"
