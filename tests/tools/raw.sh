#!/usr/bin/env bash
# Raw frames in and out.
source "$(dirname "$0")/lib.sh"

# make_raw FILE LAYOUT SIZE SECONDS: full-range BT.601, as cameras deliver.
make_raw() {
  local format=$2
  [[ $2 != i420 && $2 != yv12 ]] || format=yuvj420p
  make_input -f lavfi -i "$(source_video "$3" "$4")" -f rawvideo \
    -vf "$kHaze,scale=out_range=full:out_color_matrix=bt601,format=$format" "$1"
  [ "$2" != yv12 ] || swap_planes "$1" "$3"
}

# Exchanges the chroma planes of every frame.
swap_planes() {
  python3 - "$1" "${2%x*}" "${2#*x}" <<'PYTHON'
import sys
name, width, height = sys.argv[1], int(sys.argv[2]), int(sys.argv[3])
data = open(name, "rb").read()
luma, chroma = width * height, width * height // 4
frame = luma + 2 * chroma
out = b""
for i in range(0, len(data), frame):
    y, u = i + luma, i + luma + chroma
    out += data[i:y] + data[u:i + frame] + data[y:u]
open(name, "wb").write(out)
PYTHON
}

# Full-range BT.601 goes through the library as it is.
case_exact_bytes_in_every_layout() {
  command -v python3 >/dev/null || skip "python3 is not installed"
  make_raw in.i420 i420 320x240 0.2
  make_input -f rawvideo -pix_fmt yuvj420p -s 320x240 -r 25 -i in.i420 in.y4m
  "$Y4M_REFERENCE" 12 <in.y4m >want.i420
  local layout
  for layout in i420 yv12 nv12 nv21; do
    make_raw in.$layout $layout 320x240 0.2
    dehaze --force --level 12 --raw 320x240:$layout --raw-output i420 in.$layout out.yuv
    says_nothing
    cmp out.yuv want.i420
    # Without --raw-output it comes out as it went in.
    "$DEHAZE" --level 12 --raw 320x240:$layout in.$layout same.yuv
    case $layout in
      yv12) swap_planes same.yuv 320x240 ;;
      nv*)
        make_input -f rawvideo -pix_fmt $layout -s 320x240 -i same.yuv -f rawvideo -pix_fmt yuv420p planar
        mv planar same.yuv
        ;;
    esac
    cmp same.yuv want.i420
    rm same.yuv
  done
}

case_pipes() {
  make_raw in.nv21 nv21 320x240 0.4
  dehaze --raw 320x240:nv21@30 in.nv21 want.yuv
  "$DEHAZE" --raw 320x240:nv21@30 --raw-output nv21 - - <in.nv21 >got.yuv 2>messages
  says_nothing
  cmp got.yuv want.yuv
  "$DEHAZE" --raw 320x240:nv21@30 - - <in.nv21 >out.y4m
  equal "$(stream out.y4m v r_frame_rate,color_range)" pc,30/1
}

case_to_video() {
  make_raw in.nv12 nv12 320x240 1
  dehaze --raw 320x240:nv12@30000/1001 in.nv12 out.mp4
  equal "$(stream out.mp4 v width,height,r_frame_rate,color_range)" 320,240,pc,30000/1001
  equal "$(frame_times out.mp4 | wc -l)" 25 frames
  dehaze --raw 320x240:nv12:limited@12.5 in.nv12 limited.mp4
  equal "$(stream limited.mp4 v r_frame_rate)" 25/2
  [ "$(stream limited.mp4 v color_range)" != pc ] || fail "full range"
}

case_from_video() {
  make_video in.mp4 320x240 0.2
  dehaze in.mp4 out.y4m
  dehaze --raw-output yv12 in.mp4 out.yuv
  says 'raw frames hold no audio'
  equal "$(stat -c %s out.yuv)" $((320 * 240 * 3 / 2 * 5)) bytes
}

case_wrong_format() {
  make_raw in.i420 i420 320x240 0.2
  local format
  for format in 320 320x 320x240: 320x240:rgb 320x240@0 320x240@ 0x240 -1x240 320x240:i420:x \
    320x240@1/0 99999999x2; do
    dehaze_fails 2 'raw: .* is not understood; it has to be' "--raw=$format" in.i420 out.mp4
  done
  dehaze_fails 2 'is not one of i420' --raw-output rgb in.i420 -
  dehaze_fails 2 'needs - or a name ending in .yuv' --raw-output nv21 --raw 320x240 in.i420 out.mp4
  only_files in.i420
}

case_cut_short() {
  make_raw in.i420 i420 320x240 0.2
  head -c 300000 in.i420 >cut.i420
  dehaze_fails 1 'damaged or incomplete' --raw 320x240 cut.i420 out.mp4
  dehaze_fails 1 'cut.i420: ' --raw 1280x720 cut.i420 out.mp4
  dehaze_fails 1 'standard input: ' --raw 320x240 - out.mp4 </dev/null
  only_files in.i420 cut.i420
}

run_case "$1"
