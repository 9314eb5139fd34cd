# Completion of tarvik for bash. The tool itself lists the words: tarvik complete WORDS.

_tarvik() {
    local line=${COMP_LINE:0:COMP_POINT} words reply status

    # Bash splits words at "=" and ":". The tool needs them whole; bash replaces the last part only.
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
    local word cut=$((${#typed} - ${#current}))
    while IFS=$'\t' read -r word _; do
        # What was typed is cut by its length: it may differ in case.
        [[ -n ${word:cut} ]] || continue
        printf -v word %q "${word:cut}"
        COMPREPLY+=("$word")
    done <<<"$reply"
    # A value follows "=" without a blank.
    if [[ ${#COMPREPLY[@]} -eq 1 && ${COMPREPLY[0]} == *= ]]; then
        compopt -o nospace
    fi
}

complete -F _tarvik tarvik
