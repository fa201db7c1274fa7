# Completion of q7r for fish. Verbs and options are read from the program's own help.
function __q7r_verbs
    q7r --help 2>/dev/null | sed -n '/^Subcommands:/,$s/^  \([a-z][a-z-]*\)  *\(.*\)/\1\t\2/p'
end
function __q7r_options
    set -l words (commandline -opc)
    q7r $words[2] --help 2>/dev/null | sed -n 's/^  \(-[a-zA-Z],\)\{0,1\}\(--[a-z][a-z-]*\)\( [^ ][^ ]*\)* *\(.*\)/\2\t\4/p'
end
complete -c q7r -n __fish_use_subcommand -f -a '(__q7r_verbs)'
complete -c q7r -n 'not __fish_use_subcommand; and string match -q -- "-*" (commandline -ct)' -f -a '(__q7r_options)'
