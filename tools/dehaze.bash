# bash completion for dehaze(1)
#
# Options come from the program's own help, so that they are always those of the installed version.

_dehaze_options() {
  "$1" --help 2>/dev/null | grep -oE -- '(^|[ ,])--?[a-z][a-z-]*' | grep -oE -- '--?[a-z][a-z-]*' |
    sort -u
}

_dehaze() {
  local word=${COMP_WORDS[COMP_CWORD]} before=
  [ "$COMP_CWORD" -eq 0 ] || before=${COMP_WORDS[COMP_CWORD - 1]}
  COMPREPLY=()
  case $before in
    --level | --max-frames) return ;; # numbers
  esac
  case $word in
    -*) mapfile -t COMPREPLY < <(compgen -W "$(_dehaze_options "$1")" -- "$word") ;;
  esac
}

# Where nothing is offered, bash completes the names of files.
complete -o bashdefault -o default -F _dehaze dehaze
