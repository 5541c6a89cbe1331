# Completion of senseloom's command line for bash. The tool itself knows what can stand where.
# shellcheck shell=bash

_senseloom() {
  local others
  {
    read -r others
    mapfile -t COMPREPLY
  } < <("${COMP_WORDS[0]}" --complete "${COMP_WORDS[@]:1:COMP_CWORD}" 2>/dev/null)
  COMPREPLY=("${COMPREPLY[@]%%$'\t'*}") # without what they mean
  if [[ $others == programs ]]; then mapfile -t COMPREPLY < <(compgen -c -- "${COMP_WORDS[COMP_CWORD]}"); fi
}
# Where no word fits, a file may.
complete -o default -F _senseloom senseloom
