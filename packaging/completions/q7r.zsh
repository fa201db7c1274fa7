#compdef q7r
# Completion of q7r for zsh. Verbs and options are read from the program's own help.
local -a verbs options
if ((CURRENT == 2)); then
  verbs=(${(f)"$($words[1] --help 2>/dev/null | sed -n '/^Subcommands:/,$s/^  \([a-z][a-z-]*\)  *\(.*\)/\1:\2/p')"})
  _describe verb verbs
elif [[ $PREFIX == -* ]]; then
  options=(${(f)"$($words[1] $words[2] --help 2>/dev/null |
    sed -n 's/^  \(-[a-zA-Z],\)\{0,1\}\(--[a-z][a-z-]*\)\( [^ ][^ ]*\)* *\(.*\)/\2:\4/p')"})
  _describe option options
else
  _files
fi
