#!/usr/bin/env bash
# Y4M files and pipes, and the bytes that go through the library.
source "$(dirname "$0")/lib.sh"

y4m_header() { head -n 1 "$1" | tr '\0' ' '; }

# make_y4m FILE SIZE SECONDS RANGE [RATE]
make_y4m() {
  local format=yuv420p
  [ "$4" != full ] || format=yuvj420p
  make_input -f lavfi -i "$(source_video "$2" "$3" "${5:-25}")" \
    -vf "$kHaze,scale=${2/x/:}:out_range=$4,format=$format" "$1"
}

planes_of() { ffmpeg -nostdin -v error -i "$1" -f rawvideo -; }

# Full-range BT.601 in, and so nothing but the library between input and output.
case_exact_library_bytes() {
  local size level
  for size in 320x240 1280x720 130x128; do
    make_y4m in.y4m $size 0.2 full
    for level in 0 30; do
      dehaze --force --level $level in.y4m out.y4m
      "$Y4M_REFERENCE" $level <in.y4m >want.raw
      planes_of out.y4m >got.raw
      cmp got.raw want.raw || fail "$size at level $level differs from the library's own result"
      cmp -s got.raw <(planes_of in.y4m) && fail "the reference changes nothing"
    done
  done
  true
}

# JPEG stores full-range BT.601 4:2:0 as well; what is encoded must be the library's bytes.
case_exact_library_bytes_of_jpeg() {
  make_picture in.jpg 320x240 yuvj420p
  make_input -i in.jpg -f yuv4mpegpipe in.y4m
  dehaze --level 20 in.jpg out.jpg
  "$Y4M_REFERENCE" 20 <in.y4m >want.raw
  make_input -f rawvideo -s 320x240 -pix_fmt yuvj420p -i want.raw -q:v 2 want.jpg
  cmp <(planes_of out.jpg) <(planes_of want.jpg)
}

case_file_and_pipe_agree() {
  make_y4m in.y4m 320x240 0.4 limited
  dehaze in.y4m from_file.y4m
  "$DEHAZE" - - <in.y4m >from_pipe.y4m 2>messages
  says_nothing
  cmp from_file.y4m from_pipe.y4m
  "$DEHAZE" - mixed.y4m <in.y4m
  cmp from_file.y4m mixed.y4m
  "$DEHAZE" in.y4m - >mixed2.y4m
  cmp from_file.y4m mixed2.y4m
}

case_between_two_programs() {
  make_video in.mp4 320x240 1
  ffmpeg -nostdin -v error -i in.mp4 -f yuv4mpegpipe - | "$DEHAZE" - - |
    ffmpeg -v error -f yuv4mpegpipe -i - -c:v ffv1 out.mkv
  equal "$(frame_times out.mkv | wc -l)" 25 frames
  dehaze in.mp4 want.y4m
  says 'Y4M holds no audio'
  equal "$(frame_digest out.mkv | cut -d, -f6)" "$(frame_digest want.y4m | cut -d, -f6)"
}

case_header_is_kept() {
  make_y4m in.y4m 321x241 0.2 limited 30000/1001
  make_input -i in.y4m -vf setsar=4/3 -f yuv4mpegpipe stretched.y4m
  dehaze stretched.y4m out.y4m
  local word
  for word in W321 H241 F30000:1001 A4:3 C420; do
    y4m_header out.y4m | holds " $word" || fail "no $word in $(y4m_header out.y4m)"
  done
  make_y4m full.y4m 320x240 0.2 full
  dehaze full.y4m full_out.y4m
  equal "$(stream full_out.y4m v color_range)" "$(stream full.y4m v color_range)" range
  equal "$(stream full_out.y4m v color_range)" pc range
}

# Chroma of every subsampling ends up as 4:2:0, in the same place.
case_other_subsampling() {
  make_y4m sharp.y4m 320x240 0.04 limited
  make_input -i sharp.y4m -vf gblur=6 in.y4m
  dehaze --level 10 in.y4m want.png
  local format
  for format in yuv422p yuv444p yuv411p; do
    make_input -i in.y4m -vf "zscale=f=spline36,format=$format" -strict -1 other.y4m
    dehaze --force --level 10 other.y4m out.y4m
    equal "$(stream out.y4m v pix_fmt)" yuv420p
    dehaze --force --level 10 other.y4m out.png
    close_pictures out.png want.png 30
  done
  make_input -i in.y4m -pix_fmt gray grey.y4m
  dehaze --level 10 grey.y4m grey_out.y4m
  make_input -i grey_out.y4m -vf extractplanes=u u.png
  make_input -f lavfi -i color=0x808080:size=160x120 -frames:v 1 -vf format=gray neutral.png
  same_picture u.png neutral.png
}

case_max_frames() {
  make_y4m in.y4m 320x240 1 limited
  "$DEHAZE" --max-frames 3 - - <in.y4m >out.y4m
  equal "$(frame_times out.y4m | wc -l)" 3 frames
  dehaze --max-frames 300 in.y4m all.y4m
  equal "$(frame_times all.y4m | wc -l)" 25 frames
}

case_closed_pipe_is_quiet() {
  make_y4m in.y4m 640x480 2 limited
  local status=0
  { "$DEHAZE" in.y4m - 2>messages || echo $? >status; } | head -c 1000 >/dev/null
  says_nothing
  equal "$(cat status)" 141 status # 128 + SIGPIPE
}

case_pipe_that_is_not_y4m() {
  make_video in.mp4 160x160 0.2
  dehaze_fails 1 'standard input: not a YUV4MPEG2 stream' - out.mp4 <in.mp4
  dehaze_fails 1 'standard input: not a YUV4MPEG2 stream' - - </dev/null
  only_files in.mp4
}

case_pipe_that_breaks_off() {
  make_y4m in.y4m 320x240 0.4 limited
  head -c 700000 in.y4m >cut.y4m
  local status=0
  "$DEHAZE" - out.mp4 <cut.y4m 2>messages || status=$?
  equal $status 1 status
  says 'standard input: the video is damaged or incomplete: the last frame is cut short'
  only_files in.y4m cut.y4m
}

# True if the process has a handler for SIGTERM (15, so bit 14 of the mask).
catches_term() {
  local mask
  mask=$(sed -nE 's/^SigCgt:[[:space:]]*//p' "/proc/$1/status")
  (((0x$mask >> 14) & 1))
}

case_nobody_writes() {
  # The first frame never comes; a signal has to get through.
  mkfifo pipe
  sleep 20 >pipe &
  local writer=$! status=0
  env --default-signal=TERM "$DEHAZE" - out.mp4 <pipe 2>messages &
  local reader=$!
  for _ in $(seq 100); do
    catches_term $reader && break
    sleep 0.05
  done
  kill -TERM $reader
  wait $reader || status=$?
  kill $writer
  equal $status 143 status
  says 'interrupted'
  only_files pipe
}

# A stage that fails ends the others, also one that waits for more input.
case_failure_while_the_input_waits() {
  [ -c /dev/full ] || skip "there is no /dev/full"
  make_y4m in.y4m 320x240 0.12 limited
  mkfifo pipe
  { cat in.y4m; exec sleep 30; } >pipe &
  local writer=$! status=0
  timeout 20 "$DEHAZE" - - <pipe >/dev/full 2>messages || status=$?
  kill $writer 2>/dev/null || true
  equal $status 1 status
  says 'cannot write the output: No space left on device'
}

case_signal_while_the_output_waits() {
  # Nobody reads on: the encoder waits in a write, the others behind it.
  make_y4m in.y4m 640x480 2 limited
  mkfifo pipe
  sleep 30 <pipe &
  local reader=$! status=0
  env --default-signal=TERM "$DEHAZE" in.y4m - >pipe 2>messages &
  local process=$!
  sleep 1
  kill -TERM $process
  wait $process || status=$?
  kill $reader
  equal $status 143 status
  says 'interrupted'
}

case_standard_output_is_full() {
  [ -c /dev/full ] || skip "there is no /dev/full"
  make_y4m in.y4m 320x240 0.4 limited
  local status=0
  "$DEHAZE" in.y4m - >/dev/full 2>messages || status=$?
  equal $status 1 status
  says 'cannot write the output: No space left on device'
}

case_terminal_as_output() {
  command -v script >/dev/null || skip "script(1) is not installed"
  make_y4m in.y4m 160x160 0.2 limited
  local status=0
  script -qec "$DEHAZE in.y4m -" typescript >/dev/null </dev/null || status=$?
  equal $status 2 status
  grep -aq 'standard output is a terminal' typescript || fail "$(cat -v typescript)"
}

run_case "$1"
