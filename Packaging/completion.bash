# Completion of OvrinMerge for bash.
_ovrinmerge() {
    local word=${COMP_WORDS[COMP_CWORD]} command=${COMP_WORDS[1]-} options=
    COMPREPLY=()
    if [ "$COMP_CWORD" -eq 1 ]; then
        mapfile -t COMPREPLY < <(compgen -W "merge diff strip unittest" -- "$word")
        return
    fi
    case $command in
    merge)
        options="-l -r -p -i -o -h --describe --rules --typeInfo --fallback --force --timing --nothreads"
        if [ "${COMP_WORDS[COMP_CWORD - 1]}" = --fallback ]; then
            mapfile -t COMPREPLY < <(compgen -W none -- "$word")
        fi
        ;;
    diff | strip) options="-h --rules --typeInfo --timing --nothreads" ;;
    esac
    if [[ $word == -* ]]; then
        mapfile -t COMPREPLY < <(compgen -W "$options" -- "$word")
    fi
}
# Without a match above, readline completes file names.
complete -o bashdefault -o default -F _ovrinmerge OvrinMerge
