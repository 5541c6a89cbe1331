#compdef senseloom
# Completion of senseloom's command line for zsh. The tool itself knows what can stand where.

_senseloom() {
  local -a answer candidates
  local line
  answer=("${(@f)$("${words[1]}" --complete "${(@)words[2,CURRENT]}" 2>/dev/null)}")
  for line in "${(@)answer[2,-1]}"; do
    candidates+=("${${line%%$'\t'*}//:/\\:}:${line#*$'\t'}")
  done
  (( ${#candidates} )) && _describe senseloom candidates
  case ${answer[1]} in
    files) _files ;;
    folders) _files -/ ;;
    programs) _command_names -e ;;
  esac
}

[[ $funcstack[1] == _senseloom ]] && _senseloom "$@" || compdef _senseloom senseloom
