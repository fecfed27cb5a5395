# What bash offers after "quorl".

_quorl_playlists() {
    local current=$1 program=$2 quote='' name names
    if [[ $current == [\"\']* ]]; then
        quote=${current:0:1}
        current=${current:1}
    else
        current=${current//\\/}
    fi
    mapfile -t names < <("$program" --playlists 2>/dev/null | cut -f4)
    for name in "${names[@]}" none; do
        if [[ $name == "$current"* ]]; then
            [[ -n $quote ]] || printf -v name %q "$name"
            COMPREPLY+=("$name")
        fi
    done
}

_quorl() {
    local current=${COMP_WORDS[COMP_CWORD]} previous=${COMP_WORDS[COMP_CWORD - 1]}
    COMPREPLY=()
    case $previous in
    --choose)
        _quorl_playlists "$current" "$1"
        ;;
    --music | --wearable | --plugins)
        compopt -o filenames
        mapfile -t COMPREPLY < <(compgen -d -- "$current")
        ;;
    --screenshot)
        compopt -o filenames
        mapfile -t COMPREPLY < <(compgen -f -- "$current")
        ;;
    --pane)
        mapfile -t COMPREPLY < <(compgen -W 'root playlist limit front' -- "$current")
        ;;
    --limit | --size | --scale) ;;
    *)
        mapfile -t COMPREPLY < <(compgen -W '--text --screenshot --library --playlists --wearables --status
            --json --use-wearable --use-music --choose --limit --sync --cancel --wait --music --wearable --plugins --size --scale --dark
            --pane --help -h --version' -- "$current")
        ;;
    esac
}

complete -F _quorl quorl
