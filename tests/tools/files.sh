#!/usr/bin/env bash
# The output file: complete under its name, or not there.
source "$(dirname "$0")/lib.sh"

case_existing_output() {
  make_picture in.png 160x160
  echo precious >out.png
  dehaze_fails 1 'out.png: exists already; use --force' in.png out.png
  equal "$(cat out.png)" precious
  dehaze --force in.png out.png
  equal "$(stream out.png v width)" 160
  only_files in.png out.png
}

case_failure_keeps_the_old_output() {
  make_video in.mp4 320x240 1 -movflags +faststart
  head -c $(($(stat -c %s in.mp4) / 2)) in.mp4 >cut.mp4
  echo precious >out.mp4
  dehaze_fails 1 'damaged or incomplete' --force cut.mp4 out.mp4
  equal "$(cat out.mp4)" precious
  only_files in.mp4 cut.mp4 out.mp4
}

case_output_is_the_input() {
  make_picture in.png 160x160
  cp in.png copy.png
  ln in.png hard.png
  ln -s in.png soft.png
  local name
  for name in in.png ./in.png hard.png soft.png; do
    dehaze_fails 1 'is the input file' in.png $name
    dehaze_fails 1 'is the input file' --force in.png $name
  done
  cmp in.png copy.png
}

case_link_as_output() {
  make_picture in.png 160x160
  mkdir folder
  echo old >folder/real.png
  ln -s folder/real.png out.png
  dehaze --force in.png out.png
  [ -L out.png ] || fail "the link was replaced"
  equal "$(stream folder/real.png v width)" 160
}

case_not_a_file() {
  make_picture in.png 160x160
  mkfifo pipe.y4m
  dehaze_fails 1 'not a regular file' --force in.png pipe.y4m
  dehaze_fails 1 'missing: no such folder' in.png missing/out.png
  only_files in.png pipe.y4m
}

case_unwritable_folder() {
  make_picture in.png 160x160
  mkdir locked
  chmod 555 locked
  if [ "$(id -u)" -eq 0 ]; then
    command -v setpriv >/dev/null || skip "root may write anywhere and setpriv is not installed"
    chmod 755 .
    # Sanitizers may need more than an unprivileged user may read; the plain tool does not.
    local status=0
    setpriv --reuid=65534 --regid=65534 --clear-groups "$DEHAZE" in.png locked/out.png \
      2>messages || status=$?
    [ $status -lt 126 ] || skip "the tool is out of reach for other users"
    equal $status 1 status
    says 'cannot create a file in that folder: Permission denied'
  else
    dehaze_fails 1 'cannot create a file in that folder: Permission denied' in.png locked/out.png
  fi
  rmdir locked
}

case_full_disk() {
  make_picture in.png 640x480
  make_video in.mp4 640x480 1
  mkdir disk
  mount -t tmpfs -o size=16k none disk 2>/dev/null || skip "a small file system cannot be mounted"
  trap 'umount disk; rm -rf "$folder"' EXIT
  local pair
  for pair in png:png mp4:mp4 mp4:mkv mp4:y4m; do
    dehaze_fails 1 'No space left on device' "in.${pair%:*}" "disk/out.${pair#*:}"
    equal "$(ls -A disk)" "" "files left on the disk"
  done
}

# run_and_signal SIGNAL: starts a long run, sends the signal when the unfinished file is there.
run_and_signal() {
  # Shells start background jobs with SIGINT ignored.
  env --default-signal="$1" "$DEHAZE" in.y4m out.mp4 2>messages &
  local process=$! status=0
  for _ in $(seq 100); do
    [ -n "$(find . -name '.out.*.part.mp4' -size +0)" ] && break
    sleep 0.05
  done
  [ -n "$(find . -name '.out.*.part.mp4')" ] || fail "no unfinished file: $(cat messages)"
  [ ! -e out.mp4 ] || fail "an unfinished file under the final name"
  kill -s "$1" $process
  wait $process || status=$?
  equal $status "$2" status
  says 'interrupted; no unfinished file was left behind'
  only_files in.y4m
}

case_signals() {
  make_input -f lavfi -i "$(source_video 640x480 20)" -pix_fmt yuv420p in.y4m
  run_and_signal INT 130
  run_and_signal TERM 143
  run_and_signal HUP 129
}

# Whoever insists does not wait for the end of the frame.
case_second_signal() {
  make_input -f lavfi -i "$(source_video 640x480 20)" -pix_fmt yuv420p in.y4m
  env --default-signal=INT "$DEHAZE" in.y4m out.mp4 2>messages &
  local process=$! status=0
  for _ in $(seq 100); do
    [ -n "$(find . -name '.out.*.part.mp4' -size +0)" ] && break
    sleep 0.05
  done
  # While it is stopped, so that both are there before it can look at the first.
  kill -STOP $process
  kill -INT $process
  kill -TERM $process
  kill -CONT $process
  wait $process || status=$?
  [ $status -eq 130 ] || [ $status -eq 143 ] || fail "status $status"
  says_nothing
  only_files in.y4m
}

# Killed without a chance to clean up: nothing under the output's name, and the next run works.
case_killed() {
  make_input -f lavfi -i "$(source_video 640x480 20)" -pix_fmt yuv420p in.y4m
  echo precious >old.mp4
  local name process
  for name in new old; do
    "$DEHAZE" --force in.y4m $name.mp4 2>messages &
    process=$!
    for _ in $(seq 100); do
      [ -n "$(find . -name ".$name.*.part.mp4" -size +0)" ] && break
      sleep 0.05
    done
    kill -KILL $process
    wait $process 2>/dev/null || true
  done
  [ ! -e new.mp4 ] || fail "a file that is not complete"
  equal "$(cat old.mp4)" precious
  dehaze --force --max-frames 5 in.y4m old.mp4
  equal "$(frame_times old.mp4 | wc -l)" 5 frames
}

case_full_disk_for_a_folder() {
  mkdir in disk
  make_picture in/a.png 1280x960
  cp in/a.png in/b.png
  mount -t tmpfs -o size=64k none disk 2>/dev/null || skip "a small file system cannot be mounted"
  trap 'umount disk; rm -rf "$folder"' EXIT
  local status=0
  "$DEHAZE" in -o disk/out 2>messages || status=$?
  equal $status 1 status
  says 'No space left on device'
  says '^dehaze: 0 done, 0 skipped because the output exists, 2 failed'
  equal "$(find disk -type f)" "" "files left on the disk"
}

case_two_runs_side_by_side() {
  make_video in.mp4 320x240 1
  "$DEHAZE" in.mp4 out.mp4 2>first &
  local other=$! failures=0
  "$DEHAZE" in.mp4 out.mp4 2>second || failures=1
  wait $other || failures=$((failures + 1))
  # Whoever comes second finds the file of the other.
  equal $failures 1 "failed runs"
  cat first second >messages
  says 'exists already'
  equal "$(frame_times out.mp4 | wc -l)" 25 frames
  only_files in.mp4 out.mp4 first second
}

case_awkward_folders_and_names() {
  make_picture in.png 160x160
  # Nobody makes files there.
  dehaze_fails 1 '/proc/out.png: cannot create a file in that folder' in.png /proc/out.png
  # The name of the unfinished file is shortened, that of the result is not.
  dehaze_fails 1 'cannot rename the finished file: File name too long' in.png \
    "$(printf 'x%.0s' $(seq 300)).png"
  only_files in.png
}

case_files_of_limited_size() {
  # Noise makes large files, so that the limit is above what a coverage build writes on the side.
  make_input -f lavfi -i testsrc=size=1280x960 -vf noise=alls=60 -frames:v 1 in.png
  trap '' XFSZ
  ulimit -f 400 # blocks of a kilobyte
  local kind
  for kind in png jpg webp; do
    dehaze_fails 1 'cannot write the picture: File too large' in.png out.$kind
  done
  dehaze_fails 1 'out.html: cannot write the page: File too large' report in.png -o out.html
  only_files in.png
}

run_case "$1"
