#!/usr/bin/env bash
# The manual page and the bash completion: both know every option.
source "$(dirname "$0")/lib.sh"

# Long options, one per line.
options_of_help() { # [report]
  "$DEHAZE" "$@" --help | grep -oE -- '--[a-z][a-z-]*' | sort -u
}

case_page_has_every_option() {
  sed -nE 's/^\.It (Fl [^ ]+ .*, )?Fl Fl ([a-z-]+).*/--\2/p' "$MANUAL" | sort -u >documented
  [ -s documented ] || fail "no options in the manual page"
  sort -u <(options_of_help) <(options_of_help report) >offered
  diff offered documented || fail "the help (<) and the manual page (>) differ"
}

case_page_is_well_formed() {
  command -v man >/dev/null || skip "man is not installed"
  MANWIDTH=80 man --warnings -l "$MANUAL" >page 2>messages
  says_nothing
  grep -q "$VERSION" page || fail "no version in the manual page"
}

# completed WORD...: what is offered for the last word.
completed() {
  COMP_WORDS=("$DEHAZE" "$@")
  COMP_CWORD=$#
  _dehaze "$DEHAZE" "${!#}" "${COMP_WORDS[COMP_CWORD - 1]}"
  printf '%s\n' "${COMPREPLY[@]}"
}

case_completion() {
  # shellcheck disable=SC1090
  source "$COMPLETION"
  completed -- | sort -u >offered
  local option
  for option in $(options_of_help); do
    grep -qx -- "$option" offered || fail "$option is not completed"
  done
  equal "$(completed --lev)" --level
  equal "$(completed --level '')" ""
  equal "$(completed --engine p | tr '\n' ' ')" "photo preview "
  equal "$(completed in.png)" ""
  completed report in.png -- | sort -u >offered
  options_of_help report >wanted
  diff offered wanted || fail "the completion of report (<) and its help (>) differ"
  touch readme.jpg
  equal "$(completed re | tr '\n' ' ')" "report readme.jpg "
  equal "$(completed in.png re)" ""
}

run_case "$1"
