# Sourced by scripts that run several steps.

# step <name> <command>...: runs the command, and says how long it took or how to repeat it.
step() {
    local name=$1
    shift
    local begin=$SECONDS
    echo "=== $name: $*"
    if ! "$@"; then
        echo "=== $name FAILED after $((SECONDS - begin)) s. To repeat it: $*" >&2
        exit 1
    fi
    echo "=== $name: done in $((SECONDS - begin)) s"
}
