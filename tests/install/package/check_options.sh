#!/usr/bin/env bash
# Fails when the tool, its completion and its manual page differ in commands or options: check_options.sh TOOL SHARE
set -euo pipefail
tool=$1
manual=$(sed 's|\\||g' "$2/man/man1/senseloom.1")
# shellcheck source=/dev/null
source "$2/bash-completion/completions/senseloom"

# What the completion offers for the last of the words.
offered() {
  COMP_WORDS=("$@")
  COMP_CWORD=$(($# - 1))
  COMPREPLY=()
  _senseloom
  printf '%s\n' "${COMPREPLY[@]}" | sort
}

# Compares what the tool has with what is said of it, one item a line.
same() {
  diff <(echo "$2") <(echo "$3") && return
  echo "^ $1: < the tool, > what should say the same"
  exit 1
}

# Goes through a command, given by its words, and the commands below it.
known=""
check() {
  local help options commands command
  help=$("$tool" "$@" --help)
  options=$(sed -nE 's/^  (-[a-zA-Z],)?(--[a-z-]+).*/\2/p' <<<"$help" | sort)
  commands=$(sed -nE '/^Subcommands:/,/^$/s/^  ([a-z]+).*/\1/p' <<<"$help" | sort)
  known+=$options$'\n'
  same "completion of the options of senseloom $*" "$options" "$(offered "$tool" "$@" --)"
  if [ -z "$commands" ]; then
    grep -q "^\.SS \"$*\b" <<<"$manual" || { echo "The manual has no heading for senseloom $*"; exit 1; }
    return
  fi
  same "completion of the commands of senseloom $*" "$commands" "$(offered "$tool" "$@" "")"
  for command in $commands; do check "$@" "$command"; done
}
check
same "options in the manual" "$(sort -u <<<"$known" | grep .)" "$(grep -oE -- '--[a-z-]+' <<<"$manual" | sort -u)"
