# Bash completion for quorrel: subcommands, their options and kinds, file operands.
_quorrel() {
  local cur prev command word
  cur=${COMP_WORDS[COMP_CWORD]}
  prev=${COMP_WORDS[COMP_CWORD - 1]}
  for word in "${COMP_WORDS[@]:1:COMP_CWORD-1}"; do
    case $word in
      run | shell | inspect | convert | list | menu | strings) command=$word; break ;;
    esac
  done
  # After --, every word is a file.
  for word in "${COMP_WORDS[@]:1:COMP_CWORD-1}"; do
    [[ $word == -- ]] && { COMPREPLY=($(compgen -f -- "$cur")); return; }
  done
  case $prev in
    --module) COMPREPLY=($(compgen -f -- "$cur")); return ;;
    --to | --from) COMPREPLY=($(compgen -W "native host csv ini csv-rfc4180 json" -- "$cur")); return ;;
    --rows | --width) return ;;
  esac
  local options
  case $command in
    "") COMPREPLY=($(compgen -W "run shell inspect convert list menu strings --module --ascii --help --version" -- "$cur")); return ;;
    run) options="--echo --no-warn-files --strict --help" ;;
    shell) options="--echo --no-warn-files --strict --help" ;;
    inspect) options="--rows --all --width --keys --from --to --header --lenient --help" ;;
    convert) options="--from --to --header --lenient --force --help" ;;
    list) COMPREPLY=($(compgen -W "actions expressions --help" -- "$cur")); return ;;
    menu) COMPREPLY=($(compgen -W "actions expressions conditions" -- "$cur")); return ;;
    strings) COMPREPLY=($(compgen -W "actions expressions" -- "$cur")); return ;;
  esac
  if [[ $cur == -* ]]; then
    COMPREPLY=($(compgen -W "$options" -- "$cur"))
  else
    COMPREPLY=($(compgen -f -- "$cur"))
  fi
}
complete -o filenames -F _quorrel quorrel
