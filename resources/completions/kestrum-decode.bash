# bash completion for kestrum-decode
_kestrum_decode() {
    local current=${COMP_WORDS[COMP_CWORD]} previous=${COMP_WORDS[COMP_CWORD - 1]}
    COMPREPLY=()
    case $previous in
        --technology)
            mapfile -t COMPREPLY < <(compgen -W 'ifx gsm cdma lte utran' -- "$current") ;;
        --format)
            mapfile -t COMPREPLY < <(compgen -W 'tree json jsonl csv geojson' -- "$current") ;;
        --extract)
            compopt -o filenames 2>/dev/null
            mapfile -t COMPREPLY < <(compgen -d -- "$current") ;;
        *)
            if [[ $current == -* ]]; then
                mapfile -t COMPREPLY < <(compgen -W '-h --help --version --technology --format --log --numbers --events --cells --compare --stats
                    --follow --extract --force -j --jobs' -- "$current")
            else
                compopt -o filenames 2>/dev/null
                mapfile -t COMPREPLY < <(compgen -f -- "$current")
            fi ;;
    esac
} && complete -F _kestrum_decode kestrum-decode
