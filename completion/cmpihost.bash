# Completion of cmpihost's commands, options, classes and properties for bash.
# shellcheck shell=bash

# Asks the program that is being typed, with the schema that is named; quiet where it fails.
_cmpihost_ask() {
    local schema=() index
    for ((index = 1; index < COMP_CWORD; ++index)); do
        if [[ ${COMP_WORDS[index]} == --schema ]]; then
            [[ ${COMP_WORDS[++index]} == = ]] && ((++index))
            schema+=(--schema "${COMP_WORDS[index]}")
        fi
    done
    "${COMP_WORDS[0]/#\~/$HOME}" "${schema[@]}" "$@" 2>/dev/null </dev/null
}

_cmpihost_classes() { _cmpihost_ask classes | awk 'NF { print $1 }'; }

# _cmpihost_members <class> <heading>: the names below a heading of the class's description.
_cmpihost_members() {
    [[ -n $1 ]] || return
    _cmpihost_ask describe "$1" | awk -v heading="$2" '
        /^[A-Z]/ { below = $1 == heading; next }
        below && /^[ *] [A-Za-z_]/ { sub(/\(.*/, "", $1); print($1 == "*" ? $2 : $1) }'
}

# Sets command, class and count (of the arguments behind the command) from the words before this one.
_cmpihost_look_back() {
    local index word
    command="" class="" count=0
    for ((index = 1; index < COMP_CWORD; ++index)); do
        word=${COMP_WORDS[index]}
        case $word in
            --provider | --name | --registration | --schema | --format | --value | --properties | \
                --assoc-class | --result-class | --role | --result-role | --lang | --namespace | \
                --listen | --host-name | --tls-cert | --tls-key | --users | --connections*)
                ((++index))
                [[ ${COMP_WORDS[index]} == = ]] && ((++index))
                ;;
            = | :) # The shell makes words of their own of these: what they join is one argument.
                ((++index))
                [[ $word == : && $count == 1 ]] && class=${COMP_WORDS[index]%%.*}
                ;;
            -*) ;;
            *)
                if [[ -z $command ]]; then
                    command=$word
                else
                    ((++count))
                    [[ $count == 1 ]] && class=${word#[\'\"]} && class=${class%%.*}
                fi
                ;;
        esac
    done
    # A colon or a sign of equality before this word: it goes on with the argument before.
    case ${COMP_WORDS[COMP_CWORD - 1]} in : | =) ((count > 0)) && ((--count)) ;; esac
    case ${COMP_WORDS[COMP_CWORD]} in : | =) ((count > 0)) && ((--count)) ;; esac
}

_cmpihost_options() {
    local filters="--result-class --role"
    if [[ $command == serve ]]; then
        echo "--listen --registration --schema --host-name --tls-cert --tls-key --users --connections"
        echo "--connections-per-address --log --help --version"
        return
    fi
    echo "--provider --name --registration --schema --bare --format --value --log --time --help"
    case $command in
        "") echo "--version" ;;
        ei | gi) echo "--properties" ;;
        ai) echo "--properties --assoc-class $filters --result-role" ;;
        ain) echo "--assoc-class $filters --result-role" ;;
        ri) echo "--properties $filters" ;;
        rin) echo "$filters" ;;
        xq) echo "--lang --namespace" ;;
        tree) echo "--namespace" ;;
    esac
}

# The values of an option; fails where the word is none of an option that has values.
_cmpihost_values() {
    case $1 in
        --format) echo "table mof json" ;;
        --log) [[ $command == serve ]] && echo "none failures requests" ||
            echo "failures 3000 4000" {failures,3000,4000},{log,trace,cmpi} ;;
        --value | --properties) _cmpihost_members "$class" Properties ;;
        --assoc-class | --result-class) _cmpihost_classes ;;
        --namespace) _cmpihost_ask namespaces | awk 'NF { print $1 }' ;;
        --name | --role | --result-role | --lang | --listen | --host-name | --connections*) ;;
        *) return 1 ;;
    esac
}

# What can stand as the next argument of the command.
_cmpihost_arguments() {
    case $command:$count in
        :0) echo "ei ein gi ci mi di ai ain ri rin im xq tree classes describe namespaces serve" ;;
        describe:0)
            if [[ $current == *.* ]]; then
                { _cmpihost_members "${current%%.*}" Properties
                  _cmpihost_members "${current%%.*}" Methods; } | sed "s/^/${current%%.*}./"
            else
                _cmpihost_classes
            fi
            ;;
        ei:0 | ein:0 | gi:0 | ci:0 | mi:0 | di:0 | ai:0 | ain:0 | ri:0 | rin:0 | im:0) _cmpihost_classes ;;
        ei:* | gi:* | ai:* | ri:*) _cmpihost_members "$class" Properties ;;
        ci:* | mi:*) _cmpihost_members "$class" Properties | sed 's/$/=/' ;;
        im:1) _cmpihost_members "$class" Methods ;;
    esac
}

_cmpihost() {
    local current=${COMP_WORDS[COMP_CWORD]} before=${COMP_WORDS[COMP_CWORD - 1]}
    local command class count words
    COMPREPLY=()
    _cmpihost_look_back
    if [[ $current == = ]]; then
        current="" before=${COMP_WORDS[COMP_CWORD - 1]}
    elif [[ $before == = ]]; then
        before=${COMP_WORDS[COMP_CWORD - 2]}
    elif [[ $before == --log && $command != serve ]]; then
        # Its value stands behind a sign of equality only.
        before=""
    fi
    case $before in
        --provider | --registration | --schema | --tls-cert | --tls-key | --users)
            compopt -o filenames 2>/dev/null
            mapfile -t COMPREPLY < <(compgen -f -- "$current")
            return
            ;;
    esac
    if ! words=$(_cmpihost_values "$before"); then
        if [[ $current == -* ]]; then
            words=$(_cmpihost_options)
        else
            words=$(_cmpihost_arguments)
        fi
    fi
    [[ $words == *= ]] && compopt -o nospace 2>/dev/null
    mapfile -t COMPREPLY < <(compgen -W "$words" -- "$current")
}

complete -F _cmpihost cmpihost
