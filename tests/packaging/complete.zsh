# complete.zsh FOLDER WORK LINE...: what zsh offers, with the completion functions of the folder, for
# lines that one types: for each line a line of words. WORK is a folder to write to.
zmodload zsh/zpty || exit 1
export LC_ALL=C
folder=$1 offers=$2/offers
shift 2
: >"$offers"

# In the shell in which one types, every word that is offered goes to the file, too.
cat >"$offers.setup" <<SETUP
PS1=
fpath=($folder \$fpath)
autoload -Uz compinit
compinit -u -D
compadd() {
    if [[ \${@[1,(i)(-|--)]} == *-(O|A|D)\ * ]]; then
        builtin compadd "\$@"
        return
    fi
    local -a hits
    builtin compadd -A hits "\$@"
    print -rl -- \$hits >>$offers
    builtin compadd "\$@"
}
finish() {
    print END >>$offers
    zle kill-whole-line
}
zle -N finish
bindkey '^X' list-choices
bindkey '^E' finish
SETUP
zpty -b shell "ZDOTDIR=/nonexistent PATH=$PATH TERM=dumb zsh -f -i"
zpty -w shell ". $offers.setup"
count=0
for line in "$@"; do
    zpty -n -w shell "$line"$'\x18\x05'
    ((++count))
    for wait in {1..200}; do
        [[ $(grep -c '^END$' "$offers") == "$count" ]] && break
        zpty -r -t shell rest
        sleep 0.05
    done
done
zpty -d shell
words=()
while read -r word; do
    if [[ $word == END ]]; then
        print -r -- ${(ou)words}
        words=()
    else
        words+=("$word")
    fi
done <"$offers"
