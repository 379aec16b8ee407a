#!/usr/bin/env bash
# Command line, messages and progress.
source "$(dirname "$0")/lib.sh"

case_version() { equal "$("$DEHAZE" --version)" "dehaze $VERSION"; }

case_help() {
  "$DEHAZE" --help >help
  grep -q -- '--level' help || fail "no options in the help"
  grep -q '^Examples:' help || fail "no examples in the help"
}

case_wrong_usage() {
  make_picture in.png 160x160
  dehaze_fails 2 'INPUT is required'
  dehaze_fails 2 'OUTPUT is required' in.png
  dehaze_fails 2 '3 names: several inputs need -o' in.png out.png third.png
  dehaze_fails 2 'not expected' --bogus in.png out.png
  dehaze_fails 2 'not in range' --level high in.png out.png
  dehaze_fails 2 'not in range' --level 256 in.png out.png
  dehaze_fails 2 'not in range' --level -1 in.png out.png
  dehaze_fails 2 'strength: "high" is neither auto nor in range' --strength high in.png out.png
  dehaze_fails 2 'strength: "101" is neither auto nor in range' --strength 101 in.png out.png
  dehaze_fails 2 'excludes' --strength 50 --level 10 in.png out.png
  dehaze_fails 2 'excludes' --level 10 --strength auto in.png out.png
  dehaze_fails 2 'level is a number of the preview engine' --level 10 --engine photo in.png out.png
  dehaze_fails 2 'engine: "fast" is not one of photo, preview' --engine fast in.png out.png
  dehaze_fails 2 'show: "haze" is not one of compare, light, map' --show haze in.png out.png
  dehaze_fails 2 'show light prints to standard output' --show light in.png -
  dehaze_fails 2 'not in range' --max-frames 0 in.png out.png
  dehaze_fails 2 'name of the input is empty' '' out.png
  dehaze_fails 2 'name of the output is empty' in.png ''
  only_files in.png
}

case_unknown_output_kind() {
  make_picture in.png 160x160
  local name
  for name in out.gif out png out. .png out.png.txt; do
    dehaze_fails 2 'unknown kind of output' in.png "$name"
  done
  only_files in.png
}

case_extension_in_capitals() {
  make_picture in.png 160x160
  dehaze in.png OUT.JPG
  equal "$(stream OUT.JPG v codec_name)" mjpeg
}

case_picture_to_video() {
  make_picture in.png 160x160
  local kind
  for kind in mp4 mov mkv y4m; do
    dehaze_fails 1 'picture cannot become a video' in.png "out.$kind"
  done
  only_files in.png
}

case_quiet() {
  make_video in.mp4 1600x900 0.2
  dehaze --engine preview in.mp4 loud.mp4
  says 'scaled down from 1600 x 900 to 1280 x 720'
  dehaze --engine preview --quiet in.mp4 quiet.mp4
  says_nothing
  # Errors are not silenced.
  dehaze_fails 1 'exists already' --quiet in.mp4 quiet.mp4
}

case_no_progress_without_terminal() {
  make_video in.mp4 160x160 1
  dehaze in.mp4 out.mp4
  says_nothing
}

case_progress_on_terminal() {
  command -v script >/dev/null || skip "script(1) is not installed"
  make_video in.mp4 160x160 1
  script -qec "$DEHAZE in.mp4 out.mp4" typescript >/dev/null </dev/null
  grep -Eaq '[0-9]+/25 frames, [0-9]+ %, [0-9.]+ frames/s, [0-9]+:[0-9]{2} left' typescript ||
    fail "no progress line in: $(cat -v typescript)"
  script -qec "$DEHAZE --quiet in.mp4 quiet.mp4" quiet_typescript >/dev/null </dev/null
  ! grep -aq 'frames/s' quiet_typescript || fail "progress in spite of --quiet"
}

case_progress_of_a_picture() {
  command -v script >/dev/null || skip "script(1) is not installed"
  make_picture in.png 640x480
  script -qec "$DEHAZE in.png out.png" typescript >/dev/null </dev/null
  local step
  for step in '1/4: reading' '2/4: taking the haze out' '4/4: writing'; do
    grep -aq "step $step" typescript || fail "no step $step in: $(cat -v typescript)"
  done
  dehaze --force in.png out.png
  says_nothing
}

case_timing() {
  make_video in.mp4 160x160 0.2
  dehaze --timing --quiet in.mp4 out.mp4
  local times='[0-9.]+ ms median, [0-9.]+ ms minimum'
  says "^dehaze: time per frame: estimate $times, 3 frames; reuse $times, 2 frames$"
  make_picture in.png 160x160
  dehaze --timing in.png out.png
  says "^dehaze: time per frame: estimate $times, 1 frame$"
}

# raw_picture FILE BYTES: 160 x 120 pixels of these three bytes.
raw_picture() {
  set +o pipefail # yes(1) ends by SIGPIPE
  yes "$2" | head -n $((160 * 120)) | tr -d '\n' >raw
  set -o pipefail
  make_input -f rawvideo -pix_fmt rgb24 -s 160x120 -i raw "$1"
}

case_compare_tool() {
  # One channel of each pixel off by one: 10 log10(255^2 * 3) = 52.90 dB.
  raw_picture a.png AAA
  raw_picture b.png ABA
  equal "$("$HAZE_COMPARE" a.png a.png)" "psnr inf dB ssim 1.0000"
  equal "$("$HAZE_COMPARE" a.png b.png)" "psnr 52.90 dB ssim 1.0000"
  "$HAZE_COMPARE" --all a.png b.png |
    holds '^psnr 52.90 dB ssim 1.0000 ciede2000 1.070 hue 0.000 degrees clipped 0.000 %$' ||
    fail "$("$HAZE_COMPARE" --all a.png b.png)"
  # Equal means and no structure in common.
  make_input -f lavfi -i "color=gray:size=160x120,noise=alls=40:all_seed=1" -frames:v 1 n1.png
  make_input -f lavfi -i "color=gray:size=160x120,noise=alls=40:all_seed=2" -frames:v 1 n2.png
  "$HAZE_COMPARE" n1.png n2.png | holds 'ssim -?0\.0' || fail "$("$HAZE_COMPARE" n1.png n2.png)"
  make_picture c.png 162x120
  ! "$HAZE_COMPARE" a.png c.png 2>/dev/null || fail "compared pictures of two sizes"
  "$HAZE_COMPARE" --join a.png b.png joined.png
  local side
  for side in a:0 b:81; do
    make_input -i "${side%:*}.png" -vf "crop=79:120:${side#*:}:0" want.png
    make_input -i joined.png -vf "crop=79:120:${side#*:}:0" got.png
    same_picture want.png got.png
  done
}

case_compare_usage() {
  "$HAZE_COMPARE" --help | holds '^haze_compare A B ' || fail "$("$HAZE_COMPARE" --help)"
  local status=0
  "$HAZE_COMPARE" one.png 2>messages || status=$?
  equal $status 2 status
  says '^haze_compare A B '
  make_picture small.png 10x200
  ! "$HAZE_COMPARE" small.png small.png 2>messages || fail "compared less than a window"
  says '^haze_compare: the pictures are too small'
}

# Nobody knows how long a pipe is; a line that wrapped could not be overwritten.
case_progress_of_a_pipe_on_a_narrow_terminal() {
  command -v script >/dev/null || skip "script(1) is not installed"
  make_input -f lavfi -i "$(source_video 160x160 1)" -pix_fmt yuv420p in.y4m
  script -qec "stty cols 15; cat in.y4m | $DEHAZE - out.mkv" typescript >/dev/null </dev/null
  grep -aq '1 frames, ' typescript || fail "$(cat -v typescript)"
  ! grep -aq 'frames/s' typescript || fail "more than 15 columns: $(cat -v typescript)"
}

case_progress_in_hours() {
  command -v script >/dev/null || skip "script(1) is not installed"
  truncate -s 4T in.raw || skip "the file system has no files of that size"
  script -qec "timeout --foreground -s INT 3 $DEHAZE --raw 160x160 in.raw out.mkv" typescript >/dev/null </dev/null || true
  grep -Eaq '[0-9]+/[0-9]+ frames, 0 %, [0-9.]+ frames/s, [0-9]+:[0-5][0-9]:[0-5][0-9] left' typescript ||
    fail "no progress line in: $(cat -v typescript)"
  only_files in.raw typescript
}

run_case "$1"
