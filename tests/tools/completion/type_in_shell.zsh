# Types lines in an interactive shell that runs in a pseudo terminal, and waits after each one.
#
#     zsh -f type_in_shell.zsh SHELL COMPLETIONS LINE...
#
# SHELL is bash or zsh. COMPLETIONS is the folder of the completions. A tab in a line asks for a completion. The
# terminal's output is written to standard error.
emulate -R zsh
zmodload zsh/zpty
shell=$1 completions=$2
shift 2

# Waits until the shell has finished with everything typed before: the second part of the word comes from printf alone.
serial=0
await() {
    local seen
    (( serial += 1 ))
    zpty -w shell "printf 'rea%s-%d\\n' dy $serial"
    zpty -r shell seen "*ready-$serial*" || exit 1
    print -r -u2 -- "$seen"
}

case $shell in
    bash) zpty shell 'bash --noprofile --norc -i'
        zpty -w shell "source ${(q)completions}/projectctl.bash" ;;
    zsh) zpty shell 'zsh -f -i'
        zpty -w shell "fpath=($HOME/functions \$fpath); autoload -Uz compinit; compinit -u -d $HOME/dump" ;;
esac
await
for line in "$@"; do
    zpty -w shell "$line"
    await
done
zpty -d shell
