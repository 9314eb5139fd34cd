# Completion of tarvik for bash. What may stand where is told by the tool itself: tarvik complete WORDS.

_tarvik() {
    local line=${COMP_LINE:0:COMP_POINT} words reply status

    # Bash takes words apart at "=" and ":"; the tool wants them whole, and bash only what is behind.
    read -ra words <<<"$line"
    [[ $line == *[[:space:]] ]] && words+=("")
    local typed=${words[-1]} current=${COMP_WORDS[COMP_CWORD]}
    [[ $current == [=:] ]] && current=

    COMPREPLY=()
    reply=$("$1" complete "${words[@]:1}" 2>/dev/null)
    status=$?
    if ((status == 1)); then
        compopt -o default
        return
    fi
    local word
    while IFS=$'\t' read -r word _; do
        [[ -n $word ]] || continue
        printf -v word %q "${word#"${typed%"$current"}"}"
        COMPREPLY+=("$word")
    done <<<"$reply"
    # What goes on behind "=" wants no blank.
    if [[ ${#COMPREPLY[@]} -eq 1 && ${COMPREPLY[0]} == *= ]]; then
        compopt -o nospace
    fi
}

complete -F _tarvik tarvik
