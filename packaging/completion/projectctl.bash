# Completion of projectctl in bash. The tool itself knows all candidates, and quotes them.
_projectctl() {
    COMPREPLY=()
    local candidate
    while IFS= read -r -d '' candidate; do
        COMPREPLY+=("$candidate")
    done < <("${1/#\~/$HOME}" __complete --bash -- "${COMP_LINE:0:COMP_POINT}" "$2" 2>/dev/null)
    if [[ ${#COMPREPLY[@]} -eq 1 && ${COMPREPLY[0]} == */ ]]; then
        compopt -o nospace # a path continues below a folder
    fi
}
complete -F _projectctl projectctl
