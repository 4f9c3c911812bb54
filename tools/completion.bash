# Completion of fwzel for bash. Verbs, options and the values of options are those that --help prints, patterns those
# that "fwzel list" prints; where nothing of it fits, file names.

# The option in front of the word that is completed: its values where --help tells them as a|b|c, else one space.
_fwzel_values() { # HELP OPTION
    local names form _
    while read -r names form _; do
        [[ ,$names, == *,"$2",* ]] || continue
        form=${form%%=[a-z0-9]*}
        if [[ $form =~ ^[a-z0-9]+(\|[a-z0-9]+)+$ ]]; then
            echo "${form//|/ }"
        elif [[ $form =~ ^[A-Z] || $form == *% ]]; then
            echo ' '
        fi
    done < <(sed -n 's/^  \(-.*\)/\1/p' <<<"$1")
}

_fwzel() {
    local fwzel=$1 word=$2 previous=$3 verb='' help words=''
    local -i i
    COMPREPLY=()
    for ((i = 1; i < COMP_CWORD && ${#verb} == 0; ++i)); do
        [[ ${COMP_WORDS[i]} == -* ]] || verb=${COMP_WORDS[i]}
    done
    help=$("$fwzel" ${verb:+"$verb"} --help 2>/dev/null) || return
    # An equals sign is a word of its own: --upload = pbo.
    if [[ $word == = ]]; then
        word=''
    elif [[ $previous == = ]]; then
        previous=${COMP_WORDS[COMP_CWORD - 2]}
    fi
    if [[ $previous == -* ]]; then
        words=$(_fwzel_values "$help" "$previous")
    fi
    if [[ -n $words ]]; then
        :
    elif [[ $word == -* ]]; then
        words=$(sed -n 's/^  \(-[^ ]*\).*/\1/p' <<<"$help" | tr , ' ')
    elif [[ -z $verb ]]; then
        words=$(sed -n '/^Subcommands:/,/^$/s/^  \([a-z]\+\).*/\1/p' <<<"$help")
    elif [[ $verb == pattern || $verb == play ]]; then
        words=$("$fwzel" list | awk '{ print $2 }')
    fi
    mapfile -t COMPREPLY < <(compgen -W "$words" -- "$word")
}

complete -o bashdefault -o default -F _fwzel fwzel
