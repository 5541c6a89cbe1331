# Completion of senseloom's command line for bash.
# shellcheck shell=bash

_senseloom_sensors() {
  "${COMP_WORDS[0]}" sensors --json 2>/dev/null | sed 's/^{"sensor":"\([^"]*\)".*/\1/'
}

_senseloom() {
  # Options of each command, and what else may follow it. Where nothing of that fits, a file may.
  local -A options=(
    [senseloom]="--help --version"
    [replay]="--help --json --quiet --all --check --log --plot --class-names"
    [explain]="--help --records --all --problems --json --plot --class-names"
    [record]="--help --output --force --max-size --follow-forks --attach"
    [status]="--help"
    [generate]="--help"
    [generate commute]="--help --seed --records"
    [sweep]="--help --session --sensor --option --set --truth --time-unit --sort --reverse --best --limit --json --plot --at-most-false --at-most-delay"
    [convert]="--help --from --columns --sensor --time-unit --output"
    [sensors]="--help --json"
  )
  local -A words=(
    [senseloom]="replay explain record status sweep generate convert sensors"
    [generate]="commute"
  )
  local current=${COMP_WORDS[COMP_CWORD]} command="" candidates longer word
  for word in "${COMP_WORDS[@]:1:COMP_CWORD-1}"; do
    longer=${command:+$command }$word
    if [[ $word && ${options[$longer]-} ]]; then command=$longer; fi
  done
  : "${command:=senseloom}"

  case ${COMP_WORDS[COMP_CWORD - 1]} in
    --log) candidates="debug info warn error none" ;;
    --output | -o | --plot | --truth) return ;; # a file
    --seed | --max-size | --attach | --class-names | --session | --option | --set | --sort | --limit | --columns | --at-most-*) return ;; # whatever one likes
    --time-unit) candidates="s ms us ns" ;;
    --from) candidates="csv" ;;
    --sensor) candidates=$(_senseloom_sensors) ;;
    --) candidates=$(compgen -c) ;;
    *)
      if [[ $current == -* ]]; then
        candidates=${options[$command]}
      elif [[ $command == explain || $command == sensors ]]; then
        candidates=$(_senseloom_sensors)
      else
        candidates=${words[$command]-}
      fi
      ;;
  esac
  mapfile -t COMPREPLY < <(compgen -W "$candidates" -- "$current")
}
complete -o default -F _senseloom senseloom
