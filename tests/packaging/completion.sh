# The completion of the shells, against the program's help and the classes that it knows.
# shellcheck shell=sh
: "${work:?}" "${KORVA_BINARY_DIR:?}" "${KORVA_SOURCE_DIR:?}"
PATH=$KORVA_BINARY_DIR/bin:$PATH
TMPDIR=$work
export TMPDIR

# One line of the words that stand in lines.
in_line() { LC_ALL=C sort -u | tr '\n' ' ' | sed 's/ $//'; }

commands_in_help() { cmpihost --help | sed -n '/^Operations:/,/^Paths:/s/^  \([a-z][a-z]*\) .*/\1/p'; }

# options_in_help [COMMAND]: long options that the help describes.
options_in_help() { cmpihost "$@" --help | grep -oE '^  (-h,)?--[a-z-]+' | grep -oE -e '--.*'; }

# What can stand behind a command: its options and the program's. Behind serve they are those of another
# program, which a 32-bit build does not have.
options_of() {
    if [ "$1" = serve ] && [ "$KORVA_WORD_SIZE" = 64 ]; then
        cmpihost-serve --help | grep -oE '^  (-h,)?--[a-z-]+' | grep -oE -e '--.*' | in_line
        return
    elif [ "$1" = serve ]; then
        bash_offers serve --
        return
    fi
    {
        options_in_help | grep -vx -e --version
        options_in_help "$1"
    } | in_line
}

# bash_offers WORD...: what bash offers for the last word, with the words split as bash splits them.
bash_offers() {
    bash -c '. "$0"
        COMP_WORDS=("$@")
        COMP_CWORD=$(($# - 1))
        _cmpihost
        printf "%s\n" "${COMPREPLY[@]}"' "$KORVA_SOURCE_DIR/completion/cmpihost.bash" cmpihost "$@" | in_line
}

# zsh_offers LINE...: for each line a line with what zsh offers.
zsh_offers() {
    need_tool zsh zsh
    zsh "$KORVA_SOURCE_DIR/tests/packaging/complete.zsh" "$KORVA_SOURCE_DIR/completion" "$work" "$@"
}

BashOffersTheCommandsAndOptionsOfTheHelp() {
    commands=$(commands_in_help)
    [ "$(echo "$commands" | wc -l)" -eq 17 ] || fail "not seventeen commands: $commands"
    expect_equal commands "$(echo "$commands" | in_line)" "$(bash_offers "")"
    expect_equal options "$(options_in_help | in_line)" "$(bash_offers --)"
    for command in $commands; do
        expect_equal "options of $command" "$(options_of "$command")" "$(bash_offers "$command" --)"
    done
}

ZshOffersTheCommandsAndOptionsOfTheHelp() {
    commands=$(commands_in_help)
    {
        echo "$commands" | in_line
        echo
        options_in_help | in_line
        echo
        for command in $commands; do
            options_of "$command"
            echo
        done
    } >"$work/told"
    set -- "cmpihost " "cmpihost --"
    for command in $commands; do set -- "$@" "cmpihost $command --"; done
    expect_equal "commands and options" "$(cat "$work/told")" "$(zsh_offers "$@")"
}

# The words behind the program's name, a row each, and what is offered for the last one.
BashOffersClassesPropertiesAndValues() {
    while IFS='|' read -r words offers; do
        eval "set -- $words"
        expect_equal "$words" "$offers" "$(bash_offers "$@")"
    done <<'ROWS'
ei KORVA_R|KORVA_RunningOS
--time gi KORVA_R|KORVA_RunningOS
--format json ein root/cimv2 : KORVA_I|KORVA_InstalledOS
ei KORVA_RunningOS ''|Antecedent Dependent
ai root/cimv2 : KORVA_RunningOS A|Antecedent
ri 'KORVA_RunningOS.A="x"' D|Dependent
mi KORVA_RunningOS Dep|Dependent=
ein KORVA_RunningOS ''|
describe KORVA_In|KORVA_InstalledOS
describe KORVA_RunningOS.|KORVA_RunningOS.Antecedent KORVA_RunningOS.Dependent
ain X --assoc-class KORVA_R|KORVA_RunningOS
ei KORVA_RunningOS --value A|Antecedent
ei KORVA_RunningOS --properties = D|Dependent
--format ''|json mof table
--format = j|json
--log =|3000 3000,cmpi 3000,log 3000,trace 4000 4000,cmpi 4000,log 4000,trace failures failures,cmpi failures,log failures,trace
--log ei KORVA_R|KORVA_RunningOS
--schema /nonexistent ei K|
ei Unknown ''|
xq x --lang ''|
tree --namespace ro|root/cimv2
serve --log f|failures
serve --log ''|failures none requests
serve --listen ''|
ROWS
    touch "$work/a file.mof"
    expect_equal files "$work/a file.mof" "$(bash_offers --schema "$work/a f")"
}

ZshOffersClassesPropertiesAndValues() {
    zsh_offers "cmpihost ei KORVA_R" "cmpihost --time ein root/cimv2:KORVA_I" "cmpihost ei KORVA_RunningOS " \
        "cmpihost describe KORVA_RunningOS." "cmpihost ain X --assoc-class KORVA_R" "cmpihost --format " \
        "cmpihost --log=failures," "cmpihost tree --namespace " "cmpihost --schema /nonexistent ei K" >"$work/offered"
    expect_equal offers "KORVA_RunningOS
KORVA_InstalledOS
Antecedent Dependent
Antecedent Dependent
KORVA_RunningOS
json mof table
failures,cmpi failures,log failures,trace
root/cimv2
" "$(cat "$work/offered")
"
}

CompletionScriptsAreQuietWithoutTheProgram() {
    PATH=/usr/bin:/bin
    if command -v cmpihost >/dev/null; then return; fi
    capture bash_offers ei K
    expect_equal output "0 " "$code $output"
}
