# Completion of kelvash in bash. The tool does the work, quoting included: what it answers is ready
# to stand in COMPREPLY. A host of the library takes this file with its own name in it.

_kelvash() {
    local answer
    # shellcheck disable=SC2034 # _filedir reads it
    local cur=$2
    mapfile -d '' -t answer < <(
        printf '%s\0' "${COMP_LINE:0:COMP_POINT}" "$COMP_WORDBREAKS" "$COMP_TYPE" "${COLUMNS:-80}" |
            ZELMAR_COMPLETE=bash "${1/#\~\//$HOME/}" 2>/dev/null
    )
    case ${answer[0]-} in
        any) _filedir ;;
        plugins) _filedir '@(so|xml)' ;;
        directories) _filedir -d ;;
    esac
    [[ -z ${answer[1]-} ]] || compopt -o nospace
    compopt -o nosort
    COMPREPLY+=("${answer[@]:2}")
}

complete -F _kelvash kelvash
