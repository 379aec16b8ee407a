# bash completion for dehaze(1)
#
# Options come from the program's own help, so that they are always those of the installed version.

_dehaze_options() { # PROGRAM [report]
  "$@" --help 2>/dev/null | grep -oE -- '(^|[ ,])--?[a-z][a-z-]*' | grep -oE -- '--?[a-z][a-z-]*' |
    sort -u
}

_dehaze() {
  local word=${COMP_WORDS[COMP_CWORD]} before= words=
  [ "$COMP_CWORD" -eq 0 ] || before=${COMP_WORDS[COMP_CWORD - 1]}
  COMPREPLY=()
  case $before in
    --level | --max-frames | --jobs | --raw) return ;; # numbers
    --strength) words=auto ;;
    --engine) words='photo preview' ;;
    --show) words='map compare light' ;;
    --raw-output) words='i420 yv12 nv12 nv21' ;;
  esac
  local mode=()
  [ "${COMP_WORDS[1]}" != report ] || mode=(report)
  if [ -z "$words" ] && [[ $word == -* ]]; then words=$(_dehaze_options "$1" "${mode[@]}"); fi
  if [ "$COMP_CWORD" -eq 1 ] && [ -n "$word" ] && [[ report == "$word"* ]]; then
    mapfile -t COMPREPLY < <(compgen -W report; compgen -f -- "$word")
    compopt -o filenames 2>/dev/null # only while completing; quotes names
    return
  fi
  [ -z "$words" ] || mapfile -t COMPREPLY < <(compgen -W "$words" -- "$word")
}

# Where nothing is offered, bash completes the names of files.
complete -o bashdefault -o default -F _dehaze dehaze
