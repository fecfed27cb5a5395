# What bash offers after "quorl-syncd".

_quorl_syncd() {
    local current=${COMP_WORDS[COMP_CWORD]} previous=${COMP_WORDS[COMP_CWORD - 1]}
    COMPREPLY=()
    case $previous in
    --music-folder | --wearable)
        compopt -o filenames
        mapfile -t COMPREPLY < <(compgen -d -- "$current")
        ;;
    --embedded-capacity | --rate-limit | --retry-after) ;;
    *)
        mapfile -t COMPREPLY < <(compgen -W '--trial --music-folder --wearable --embedded-capacity --rate-limit
            --retry-after --help -h --version' -- "$current")
        ;;
    esac
}

complete -F _quorl_syncd quorl-syncd
