#!/usr/bin/env bash
# Several inputs and folders: which results there are, and what is said about them.
source "$(dirname "$0")/lib.sh"

# files_in FOLDER: all files in it, hidden ones included, in one line.
files_in() { (cd "$1" && find . -type f -printf '%P\n' | sort | tr '\n' ' '); }

make_folder() { # FOLDER
  mkdir -p "$1/day 1/ä"
  make_picture "$1/a.png" 160x160
  make_picture "$1/day 1/-b.JPG" 160x160 yuvj420p
  make_picture "$1/day 1/ä/c.bmp" 160x160 bgr24
  make_video "$1/day 1/ä/d.avi" 160x160 0.2
  echo text >"$1/notes.txt"
  cp "$1/a.png" "$1/.hidden.png"
}

case_folder() {
  make_folder photos
  dehaze photos -o out
  equal "$(files_in out)" "a.png day 1/-b.JPG day 1/ä/c.png day 1/ä/d.mkv "
  says '^dehaze: 4 done, 0 skipped because the output exists, 0 failed; 1 other files left alone$'
  # The same as one by one.
  dehaze photos/a.png a.png
  cmp a.png out/a.png
  dehaze 'photos/day 1/ä/d.avi' d.mkv
  equal "$(frame_digest d.mkv)" "$(frame_digest 'out/day 1/ä/d.mkv')"
}

case_existing_results_are_skipped() {
  make_folder photos
  mkdir out
  echo precious >out/a.png
  dehaze photos/ out
  says '^dehaze: 3 done, 1 skipped because the output exists, 0 failed'
  equal "$(cat out/a.png)" precious
  dehaze photos out
  says '^dehaze: 0 done, 4 skipped'
  dehaze --force photos out
  says '^dehaze: 4 done, 0 skipped'
  equal "$(stream out/a.png v width)" 160
}

case_one_failure() {
  make_folder photos
  head -c 500 photos/a.png >photos/bad.png
  local status=0
  "$DEHAZE" photos -o out 2>messages || status=$?
  equal $status 1 status
  says '^dehaze: photos/bad.png: '
  says '^dehaze: 4 done, 0 skipped because the output exists, 1 failed'
  [ ! -e out/bad.png ] || fail "an output in spite of an error"
  equal "$(find out -name '*.part*')" "" "unfinished files"
}

case_several_names() {
  make_folder photos
  dehaze photos/a.png 'photos/day 1/-b.JPG' -o out/
  equal "$(files_in out)" "-b.JPG a.png "
  # One name and a folder that exists.
  dehaze 'photos/day 1/ä/c.bmp' out
  equal "$(files_in out)" "-b.JPG a.png c.png "
  dehaze_fails 1 'notes.txt: not known as a picture or video' photos/notes.txt photos/a.png -o more
  equal "$(files_in more)" "a.png "
  dehaze_fails 2 'results need a folder' photos/a.png photos/a.png -o out.png
  dehaze_fails 2 'results of several inputs need -o FOLDER' photos -o -
  dehaze_fails 2 'standard input cannot be one of several' - photos/a.png -o out
  dehaze_fails 1 'missing.png: No such file' missing.png photos/a.png -o last
  equal "$(files_in last)" "a.png "
}

case_two_inputs_of_one_name() {
  make_picture a.png 160x160
  make_picture a.bmp 160x160 bgr24
  dehaze_fails 1 'a.png: its result would be that of a.bmp as well' a.bmp a.png -o out
  equal "$(files_in out)" "a.png "
}

case_output_among_the_inputs() {
  make_folder photos
  cd photos
  dehaze . -o out
  dehaze --force . -o out
  says '^dehaze: 4 done'
  equal "$(files_in out)" "a.png day 1/-b.JPG day 1/ä/c.png day 1/ä/d.mkv "
  dehaze_fails 1 'a.png: its result would replace it' --force --no-recurse . -o .
}

case_no_recurse() {
  make_folder photos
  dehaze --no-recurse photos -o out
  equal "$(files_in out)" "a.png "
}

case_timing_and_light() {
  mkdir in
  make_picture in/a.png 160x160
  make_picture in/b.png 160x160
  "$DEHAZE" --quiet --timing --show light in -o out >light 2>messages
  equal "$(wc -l <messages)" 2 lines
  says '^dehaze: in/a.png: time per frame: estimate '
  equal "$(grep -Ec '^in/[ab].png: light [0-9. ]+strength [0-9.]+$' light)" 2 "lights in $(cat light)"
}

case_no_waiting_for_pipes() {
  mkdir in
  make_picture in/a.png 160x160
  mkfifo in/b.png
  ln -s missing.png in/c.png
  ln -s ../in in/loop
  timeout 20 "$DEHAZE" in -o out 2>messages
  equal "$(files_in out)" "a.png "
}

case_nothing_to_do() {
  mkdir empty
  dehaze_fails 1 'no pictures or videos in empty' empty -o out
  only_files empty
}

case_locked_folder() {
  make_folder photos
  mkdir photos/locked out
  chmod 000 photos/locked
  chmod 755 .
  chmod 777 out
  local status=0 as_user=()
  if [ "$(id -u)" -eq 0 ]; then
    command -v setpriv >/dev/null || skip "root may read anything and setpriv is not installed"
    as_user=(setpriv --reuid=65534 --regid=65534 --clear-groups)
    "${as_user[@]}" "$DEHAZE" --version >/dev/null 2>&1 || skip "the tool is out of reach for other users"
  fi
  "${as_user[@]}" "$DEHAZE" photos -o out 2>messages || status=$?
  equal $status 1 status
  says 'photos/locked: Permission denied'
  says '^dehaze: 4 done, 0 skipped because the output exists, 1 failed'
}

case_number_of_jobs() {
  make_picture a.png 640x480
  local i
  mkdir in
  for i in 1 2 3 4 5 6; do cp a.png in/$i.png; done
  for i in 1 3 64; do
    dehaze --jobs $i in -o out$i
    equal "$(files_in out$i)" "1.png 2.png 3.png 4.png 5.png 6.png "
    cmp out$i/1.png out1/6.png
  done
  dehaze_fails 2 'not in range' --jobs 0 in -o out
}

# stop_batch SIGNAL STATUS TO: sends the signal to the parent, to all, or kills the parent.
stop_batch() {
  rm -rf out
  setsid env --default-signal=INT "$DEHAZE" --jobs 2 in -o out 2>messages &
  local process=$! status=0
  for _ in $(seq 200); do
    [ "$(find out -name '.*.part.mp4' -size +0 2>/dev/null | wc -l)" = 2 ] && break
    sleep 0.05
  done
  equal "$(find out -name '.*.part.mp4' | wc -l)" 2 "unfinished files"
  if [ "$3" = all ]; then kill -s "$1" -- -$process; else kill -s "$1" $process; fi
  wait $process 2>/dev/null || status=$?
  equal $status "$2" status
  for _ in $(seq 100); do
    [ -z "$(find out -type f)" ] && break
    sleep 0.05
  done
  equal "$(find out -type f)" "" "files left"
}

case_stopped() {
  mkdir in
  make_video in/a.mp4 640x480 20
  cp in/a.mp4 in/b.mp4
  cp in/a.mp4 in/c.mp4
  stop_batch INT 130 all
  says '^dehaze: 0 done, 0 skipped because the output exists, 0 failed, 3 not finished'
  stop_batch TERM 143 parent
  says 'interrupted'
  stop_batch KILL 137 parent
}

case_killed_child() {
  mkdir in
  make_video in/a.mp4 640x480 20
  "$DEHAZE" in -o out 2>messages &
  local process=$! child status=0
  for _ in $(seq 100); do
    [ -n "$(find out -name '.*.part.mp4' -size +0 2>/dev/null)" ] && break
    sleep 0.05
  done
  child=$(cat /proc/$process/task/$process/children)
  kill -KILL $child
  wait $process || status=$?
  equal $status 1 status
  says 'in/a.mp4: its process ended early, Killed'
}

case_progress_of_all() {
  command -v script >/dev/null || skip "script(1) is not installed"
  mkdir in
  make_video in/a.mp4 320x240 4
  cp in/a.mp4 in/b.mp4
  script -qec "$DEHAZE --jobs 1 in -o out" typescript >/dev/null </dev/null
  local left='[0-9.]+ files/min, [0-9]+:[0-9]{2} left'
  grep -Eaq "0/2 files, [0-9]+ %, $left; a.mp4 [0-9]+ %" typescript ||
    fail "no progress line in: $(cat -v typescript)"
  grep -Eaq "1/2 files, [0-9]+ %, $left; b.mp4" typescript || fail "$(cat -v typescript)"
  dehaze --force in -o out
  equal "$(wc -l <messages)" 1 "lines without a terminal"
}

case_file_in_place_of_a_folder() {
  make_folder photos
  mkdir out
  : >"out/day 1"
  dehaze_fails 1 'out/day 1: cannot make this folder: Not a directory' photos -o out
  says '^dehaze: 1 done, 0 skipped because the output exists, 3 failed'
  equal "$(files_in out)" "a.png day 1 "
}

run_case "$1"
