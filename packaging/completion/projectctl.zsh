#compdef projectctl
# Completion of projectctl in zsh. The tool itself knows all candidates; zsh quotes them.
local record
local -a values shown folders shownFolders
for record in "${(@0)$("${(Q)words[1]}" __complete -- "${(@Q)words[2,CURRENT-1]}" "${(Q)PREFIX}" 2>/dev/null)}"; do
    [[ -n $record ]] || continue
    if [[ $record == */$'\t'* ]]; then
        folders+=("${record%$'\t'*}")
        shownFolders+=("${(V)record%$'\t'*}")
    else
        values+=("${record%$'\t'*}")
        shown+=("${(V)record%$'\t'*}  -- ${record##*$'\t'}")
    fi
done
compadd -l -V projectctl -d shown -a values
compadd -l -V projectctl -d shownFolders -S '' -a folders # a path continues below a folder
(( $#values + $#folders ))
