# Completion of vetra's command line, for bash. What there is to complete comes from the tool.

_vetra_options() {
    "$1" $2 --help 2>/dev/null |
        sed -nE 's/^ {2,4}(-[a-z]),(--[a-z-]+).*/\1\n\2/p; s/^ {2,4}(--[a-z-]+)( .*|$)/\1/p'
}

_vetra_methods() {
    "$1" methods 2>/dev/null | sed -nE 's/^([A-Z0-9]+) +[A-Za-z0-9]+ x .*/\1/p'
}

_vetra() {
    local tool=${COMP_WORDS[0]} command= current=${COMP_WORDS[COMP_CWORD]} previous=${COMP_WORDS[COMP_CWORD-1]}
    # "--option=value" comes in three words.
    if [[ $current == = ]]; then
        current=
    elif [[ $previous == = ]]; then
        previous=${COMP_WORDS[COMP_CWORD-2]}
    fi
    if ((COMP_CWORD > 1)); then
        command=${COMP_WORDS[1]}
    fi

    local words=
    case $command:$previous:$current in
        *:*:-*)
            words=$(_vetra_options "$tool" "$command") ;;
        :*)
            words=$("$tool" --help 2>/dev/null | sed -nE '/^Subcommands:/,$ s/^ +([a-z]+) .*/\1/p') ;;
        *:--method:* | *:--overviews:* | kernel:kernel:* | methods:methods:*)
            words=$(_vetra_methods "$tool")
            # Keys may follow.
            compopt -o nospace 2>/dev/null ;;
        *:--fill:*)
            words='nn bgd' ;;
        *:--type:*)
            words=$("$tool" "$command" --help 2>/dev/null | grep -owE 'C?[0-9]+[USR]') ;;
    esac
    # Without words the names of files come.
    COMPREPLY=($(compgen -W "$words" -- "$current"))
}

complete -o default -F _vetra vetra
