# bash completion for qxtool
_qxtool_names() {
  local IFS=$'\n'
  mapfile -t COMPREPLY < <(qxtool encodings 2>/dev/null | sed 's/^0x[0-9A-F]*  //; s/  (not installed)$//; s/ | /\n/g' |
    grep -i -F -- "$1" | grep -i "^$(printf '%s' "$1" | sed 's/[][\.*^$]/\\&/g')" | sed 's/[ ()&;,]/\\&/g')
}

_qxtool() {
  local cur=${COMP_WORDS[COMP_CWORD]} prev=${COMP_WORDS[COMP_CWORD - 1]} command=${COMP_WORDS[1]}
  COMPREPLY=()
  if [ "$COMP_CWORD" = 1 ]; then
    mapfile -t COMPREPLY < <(compgen -W "detect convert escape unescape encodings find sort info zip settings ini --help --version" -- "$cur")
    return
  fi
  if [ "$command" = zip ] && [ "$COMP_CWORD" = 2 ]; then
    mapfile -t COMPREPLY < <(compgen -W "list test extract extract-all --help" -- "$cur")
    return
  fi
  if [ "$command" = settings ] || [ "$command" = ini ]; then
    local actions="get set list --help"
    [ "$command" = ini ] || actions="get set list delete --help"
    if [ "$COMP_CWORD" = 2 ]; then
      mapfile -t COMPREPLY < <(compgen -W "$actions" -- "$cur")
      return
    fi
  fi
  case $prev in
    --hint | --from | --to) _qxtool_names "$cur"; return ;;
    --level) mapfile -t COMPREPLY < <(compgen -W "none quick fair full" -- "$cur"); return ;;
    --favor) mapfile -t COMPREPLY < <(compgen -W "hint guess none" -- "$cur"); return ;;
    --by) mapfile -t COMPREPLY < <(compgen -W "text number length" -- "$cur"); return ;;
    --match | --reject) mapfile -t COMPREPLY < <(compgen -W "r h s d a v l" -- "$cur"); return ;;
    --type) mapfile -t COMPREPLY < <(compgen -W "text number binary expand" -- "$cur"); return ;;
    --replacement) mapfile -t COMPREPLY < <(compgen -W "drop" -- "$cur"); return ;;
  esac
  if [[ $cur == -* ]]; then
    local options=--help
    case $command in
      detect) options="--hint --level --favor --no-full-unicode --json --help" ;;
      convert | escape | unescape) options="--from --to --replacement --lossless --if-changed --output-dir --in-place --recursive --quiet --verbose
        --no-full-unicode --help" ;;
      encodings) options="--installed --json --help" ;;
      zip)
        case ${COMP_WORDS[2]} in
          list) options="--json --help" ;;
          extract-all) options="--max-bytes --force --help" ;;
        esac
        ;;
      settings)
        case ${COMP_WORDS[2]} in
          get) options="--json --help" ;;
          set) options="--type --help" ;;
          list) options="--recursive --json --help" ;;
          delete) options="--recursive --help" ;;
        esac
        ;;
      ini) [ "${COMP_WORDS[2]}" = set ] || options="--json --help" ;;
      find) options="--folders --sorted --match --reject --native --null --json --help" ;;
      sort) options="--by --ignore-case --reverse --from --no-full-unicode --help" ;;
      info) options="--json --help" ;;
    esac
    mapfile -t COMPREPLY < <(compgen -W "$options" -- "$cur")
  elif [ "$command" != encodings ] && [ "$command" != settings ]; then
    compopt -o filenames
    mapfile -t COMPREPLY < <(compgen -f -- "$cur")
  fi
}
complete -F _qxtool qxtool
