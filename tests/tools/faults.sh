#!/usr/bin/env bash
# What the system refuses: see faults.cpp.
source "$(dirname "$0")/lib.sh"

# The sanitizers have to be loaded first, and replace the same functions.
[ -z "${SANITIZERS:-}" ] || skip "a build with sanitizers"

with_fault() { # FAULT ARGUMENT...: the tool's status
  local status=0
  timeout -k 5 60 env LD_PRELOAD="$FAULTS" HAZE_TEST_FAULT="$1" "$DEHAZE" "${@:2}" \
    2>messages || status=$?
  echo $status
}

case_no_process() {
  mkdir in
  make_picture in/a.png 160x160
  equal "$(with_fault pipe in -o out)" 1 status
  says '^dehaze: cannot make a pipe: Too many open files'
  equal "$(with_fault fork in -o out)" 1 status
  says '^dehaze: cannot start a process: Resource temporarily unavailable'
  equal "$(find out -type f)" ""
}

case_no_memory() {
  make_picture in.png 1600x1200
  equal "$(with_fault memory in.png out.png)" 1 status
  says '^dehaze: in.png: not enough memory'
  equal "$(with_fault memory report in.png -o out.html)" 1 status
  says '^dehaze: not enough memory'
  only_files in.png
}

# Whichever thread it is, of the tool or of a codec: a message and no file, or a whole file.
case_no_thread() {
  make_video in.mp4 160x160 0.4
  local i status failures=0
  for i in $(seq 40); do
    status=$(with_fault thread-$i in.mp4 out.mkv)
    if [ "$status" -eq 0 ]; then
      equal "$(frame_times out.mkv | wc -l)" 10 frames
      rm out.mkv
      break
    fi
    equal "$status" 1 "status without thread $i"
    says '^dehaze: '
    only_files in.mp4
    ! grep -q 'cannot start a thread: Resource temporarily unavailable' messages ||
      failures=$((failures + 1))
  done
  # Those of reading, dehazing and writing.
  [ $failures -ge 3 ] || fail "$failures threads of the tool"
}

case_file_system_without_exclusive_renaming() {
  make_picture in.png 160x160
  equal "$(with_fault rename-flags in.png out.png)" 0 status
  equal "$(stream out.png v width)" 160
  # Somebody takes the name while the tool is at work.
  mkfifo pipe
  make_input -f lavfi -i "$(source_video 160x160 0.4)" -pix_fmt yuv420p in.y4m
  (
    cat in.y4m
    for _ in $(seq 100); do
      [ -z "$(find . -name '.out.*.part.mp4')" ] || break
      sleep 0.05
    done
    echo precious >out.mp4
  ) >pipe &
  equal "$(with_fault rename-flags - out.mp4 <pipe)" 1 status
  wait
  says 'out.mp4: exists already'
  equal "$(cat out.mp4)" precious
  only_files in.png out.png in.y4m pipe out.mp4
}

run_case "$1"
