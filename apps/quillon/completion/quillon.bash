# bash completion for quillon. The words come from the program itself (--help-words), so that
# they follow its commands and options.
_quillon() {
  local cur=${COMP_WORDS[COMP_CWORD]} prev=${COMP_WORDS[COMP_CWORD-1]}
  local program=${COMP_WORDS[0]} commands command="" word values=""
  commands=$("$program" --help-words commands 2>/dev/null)
  for word in "${COMP_WORDS[@]:1:COMP_CWORD-1}"; do
    if [[ $'\n'$commands$'\n' == *$'\n'$word$'\n'* ]]; then
      command=$word
      break
    fi
  done
  [[ $prev == -* ]] && values=$("$program" --help-words "$prev" 2>/dev/null)
  if [[ -n $values ]]; then
    mapfile -t COMPREPLY < <(compgen -W "$values" -- "$cur")
  elif [[ $cur == -* ]]; then
    mapfile -t COMPREPLY < <(compgen -W "$("$program" --help-words "${command:-options}" 2>/dev/null)" -- "$cur")
  elif [[ -z $command ]]; then
    mapfile -t COMPREPLY < <(compgen -W "$commands" -- "$cur")
  else
    COMPREPLY=()
  fi
}
complete -o default -F _quillon quillon
