# Completion of projectctl in fish. The tool itself knows all candidates; fish quotes them.
function __projectctl_candidates
    set -l line (commandline --current-process --cut-at-cursor | string collect)
    projectctl __complete --fish -- "$line" 2>/dev/null | string split0
end
complete --command projectctl --no-files --arguments '(__projectctl_candidates)'
