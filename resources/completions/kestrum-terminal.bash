# bash completion for kestrum-terminal
_kestrum_terminal() {
    mapfile -t COMPREPLY < <(compgen -W '-h --help --version --text' -- "${COMP_WORDS[COMP_CWORD]}")
} && complete -F _kestrum_terminal kestrum-terminal
