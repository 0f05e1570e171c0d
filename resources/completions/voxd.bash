# bash completion for voxd
_voxd() {
    local current=${COMP_WORDS[COMP_CWORD]} previous=${COMP_WORDS[COMP_CWORD - 1]}
    COMPREPLY=()
    case $previous in
        --scenario)
            mapfile -t COMPREPLY < <(compgen -W 'lte gsm cdma utran drive ifx' -- "$current") ;;
        --modem)
            mapfile -t COMPREPLY < <(compgen -W 'first all' -- "$current") ;;
        --fault)
            mapfile -t COMPREPLY < <(compgen -W 'reply-900ms reply-1100ms reply-never wrong-ids half-frame byte-by-byte
                garbage oversized flood notifications technology stop die' -- "$current") ;;
        --replay | --record | --write)
            compopt -o filenames 2>/dev/null
            mapfile -t COMPREPLY < <(compgen -f -- "$current") ;;
        --speed | --seed | --start | --seconds) ;;
        *)
            mapfile -t COMPREPLY < <(compgen -W '-h --help --version --scenario --replay --loop --modem --identities
                --speed --seed --start --record --position --write --seconds --fault' -- "$current") ;;
    esac
} && complete -F _voxd voxd
