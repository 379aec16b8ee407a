#!/usr/bin/env bash
# Results for other programs: --json, exit status, colours.
source "$(dirname "$0")/lib.sh"

# field FILE LINE EXPRESSION: of the JSON object on that line, as Python sees it.
field() {
  python3 -c '
import json, sys
lines = open(sys.argv[1], encoding="utf-8").read().splitlines()
o = json.loads(lines[int(sys.argv[2])])
print(eval(sys.argv[3]))' "$1" "$2" "$3"
}
need_python() { command -v python3 >/dev/null || skip "python3 is not installed"; }

case_json_of_a_file() {
  need_python
  make_picture 'a "b"\ä.png' 321x241
  "$DEHAZE" --json --strength 40 'a "b"\ä.png' out.png >result 2>messages
  says_nothing
  equal "$(wc -l <result)" 1 lines
  equal "$(field result 0 'o["input"]')" 'a "b"\ä.png'
  equal "$(field result 0 'o["output"], o["status"], o["width"], o["height"], o["frames"]')" \
    "('out.png', 'done', 321, 241, 1)"
  equal "$(field result 0 'o["strength"], len(o["light"]), all(0 <= a <= 255 for a in o["light"])')" \
    "(40, 3, True)"
  equal "$(field result 0 'o["seconds"] > 0, "notes" in o')" "(True, False)"
}

case_json_of_a_failure() {
  need_python
  echo no >bad.png
  local status=0
  "$DEHAZE" --json bad.png out.png >result 2>messages || status=$?
  equal $status 1 status
  says '^dehaze: bad.png: '
  equal "$(field result 0 'o["status"], o["message"].startswith("bad.png: ")')" "('failed', True)"
}

case_json_beside_a_pipe() {
  need_python
  make_video in.mp4 160x160 0.2
  "$DEHAZE" --json in.mp4 - >out.y4m 2>result
  dehaze in.mp4 want.y4m
  cmp out.y4m want.y4m
  equal "$(wc -l <result)" 1 lines
  equal "$(field result 0 'o["frames"], o["notes"]')" "(5, ['Y4M holds no audio or subtitles; they are left out'])"
}

case_json_of_a_folder() {
  need_python
  mkdir in out
  make_picture in/a.png 160x160
  make_picture in/b.png 160x160
  make_picture in/c.png 160x160 rgb48be
  echo no >in/d.png
  : >out/a.png
  local status=0
  "$DEHAZE" --quiet --json in out >result 2>messages || status=$?
  equal $status 1 status
  equal "$(wc -l <messages)" 1 "error messages"
  equal "$(wc -l <result)" 5 lines
  equal "$(field result 4 'o["summary"]')" "{'done': 2, 'skipped': 1, 'failed': 1, 'unfinished': 0}"
  local i
  for i in 0 1 2 3; do field result $i 'o["input"], o["status"], o.get("notes")'; done | sort >got
  diff got - <<'TEXT'
('in/a.png', 'skipped', None)
('in/b.png', 'done', None)
('in/c.png', 'done', ['16-bit input is converted to 8 bits'])
('in/d.png', 'failed', None)
TEXT
}

case_results_cannot_be_written() {
  [ -c /dev/full ] || skip "there is no /dev/full"
  make_picture in.png 160x160
  local status=0
  "$DEHAZE" --json in.png out.png >/dev/full 2>messages || status=$?
  equal $status 1 status
  says 'cannot write to standard output: No space left on device'
}

case_closed_json_pipe_is_quiet() {
  mkdir in
  make_picture in/a.png 160x160
  local i status=0
  for i in b c d e f g h; do cp in/a.png in/$i.png; done
  { "$DEHAZE" --quiet --json in -o out 2>messages || echo $? >status; } | true
  says_nothing
  equal "$(cat status)" 141 status
}

case_names_that_are_no_utf8() {
  need_python
  make_picture a.png 160x160
  local name
  name=$(printf 'x\xff\xc0\x80.png')
  mv a.png "$name"
  "$DEHAZE" --json "$name" out.png >result
  equal "$(field result 0 'o["input"] == "x\ufffd\ufffd\ufffd.png"')" True
}

case_color() {
  command -v script >/dev/null || skip "script(1) is not installed"
  local color=$'\033[31m'
  TERM=xterm NO_COLOR='' script -qec "$DEHAZE missing.png out.png" typescript >/dev/null </dev/null || true
  grep -aqF "$color" typescript || fail "no colour on a terminal"
  TERM=xterm NO_COLOR=1 script -qec "$DEHAZE missing.png out.png" typescript >/dev/null </dev/null || true
  ! grep -aqF "$color" typescript || fail "colour in spite of NO_COLOR"
  TERM=dumb script -qec "$DEHAZE missing.png out.png" typescript >/dev/null </dev/null || true
  ! grep -aqF "$color" typescript || fail "colour on a dumb terminal"
  dehaze_fails 1 '^dehaze: missing.png' missing.png out.png
}

case_name_with_a_dash() {
  make_picture ./-in.png 160x160
  dehaze_fails 2 'For the file of that name write ./-in.png' -in.png out.png
  dehaze ./-in.png ./-out.png
  dehaze -f -- -in.png -out.png
  dehaze ./-in.png -o ./-o.png
  only_files -in.png -out.png -o.png
}

case_json_of_control_characters() {
  need_python
  local name=$'a\tb\nc\x1b.png'
  make_picture in.png 160x160
  mv in.png "$name"
  "$DEHAZE" --json "$name" out.png >result
  equal "$(wc -l <result)" 1 lines
  equal "$(field result 0 'o["input"]')" "$name"
}

run_case "$1"
