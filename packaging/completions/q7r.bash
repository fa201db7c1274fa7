# Completion of q7r for bash. Verbs and options are read from the program's own help, so that they are always those it has.
_q7r() {
  local word=${COMP_WORDS[COMP_CWORD]} verb=${COMP_WORDS[1]-} program=${COMP_WORDS[0]} verbs
  verbs=$("$program" --help 2>/dev/null | sed -n '/^Subcommands:/,$s/^  \([a-z][a-z-]*\).*/\1/p')
  COMPREPLY=()
  if ((COMP_CWORD == 1)); then
    mapfile -t COMPREPLY < <(compgen -W "$verbs --help --version" -- "$word")
  elif [[ $word == -* ]]; then
    mapfile -t COMPREPLY < <(compgen -W "$("$program" "$verb" --help 2>/dev/null |
      sed -n 's/^  \(-[a-zA-Z],\)\{0,1\}\(--[a-z][a-z-]*\).*/\2/p')" -- "$word")
  elif [[ ${COMP_WORDS[COMP_CWORD - 1]} == --composition ]]; then
    # Names are somebody's texts: compgen would run what looks like a command in them.
    local name
    while IFS= read -r name; do
      [[ $name == "${word#[\"\']}"* ]] && COMPREPLY+=("${name@Q}")
    done < <("$program" compositions --json "${COMP_WORDS[2]}" 2>/dev/null |
      sed -n 's/^ *"name": "\(.*\)",$/\1/; T; s/\\\(["\\]\)/\1/g; p')
  fi
}
complete -o default -o bashdefault -F _q7r q7r
