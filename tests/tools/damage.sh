#!/usr/bin/env bash
# Damaged and incomplete input: always a message, never a file.
source "$(dirname "$0")/lib.sh"

# cut FILE PERCENT -> cut.EXT
cut_file() { head -c $(($(stat -c %s "$1") * $2 / 100)) "$1" >"cut.${1##*.}"; }

case_not_a_picture() {
  make_picture in.png 160x160
  : >empty.jpg
  seq 1000 >text.jpg
  head -c 5000 /dev/urandom >noise.mp4
  dehaze_fails 1 'missing.jpg: No such file' missing.jpg out.png
  dehaze_fails 1 'missing.jpg: No such file' missing.jpg out.unknown
  dehaze_fails 1 '\.: is a folder; give the name of a picture or a video' --show light .
  dehaze_fails 2 'out.png: looks like the name of a file; . is a folder' . out.png
  dehaze_fails 1 'the file is empty' empty.jpg out.png
  dehaze_fails 1 'text.jpg: not a picture or video' text.jpg out.png
  dehaze_fails 1 'noise.mp4: ' noise.mp4 out.png
  dehaze_fails 1 'in.png/in.png: Not a directory' in.png/in.png out.png
  only_files in.png empty.jpg text.jpg noise.mp4
}

case_cut_pictures() {
  make_picture in.png 320x240
  make_picture in.jpg 320x240 yuvj420p
  make_picture in.webp 320x240 yuv420p
  local kind percent
  for kind in png jpg webp; do
    for percent in 2 30 90; do
      cut_file in.$kind $percent
      dehaze_fails 1 "cut.$kind: " cut.$kind out.png
    done
  done
  only_files in.png in.jpg in.webp cut.png cut.jpg cut.webp
}

case_cut_mp4_without_index() {
  make_video in.mp4 320x240 1
  cut_file in.mp4 60
  dehaze_fails 1 'moov atom not found' cut.mp4 out.mp4
  only_files in.mp4 cut.mp4
}

case_cut_mp4() {
  make_video in.mp4 320x240 2 -movflags +faststart
  cut_file in.mp4 60
  dehaze_fails 1 'damaged or incomplete: .*--max-frames [0-9]+ takes the part' cut.mp4 out.mp4
  only_files in.mp4 cut.mp4
  # The advice is good.
  local frames
  frames=$(sed -nE 's/.*--max-frames ([0-9]+).*/\1/p' messages)
  dehaze --max-frames "$frames" cut.mp4 out.mp4
  equal "$(frame_times out.mp4 | wc -l)" "$frames" frames
}

case_cut_elsewhere() {
  make_video in.mkv 320x240 2
  make_video in.avi 320x240 2
  make_video in.ts 320x240 2
  make_input -f lavfi -i "$(source_video 320x240 0.4)" -pix_fmt yuv420p in.y4m
  local kind
  for kind in mkv avi ts y4m; do
    cut_file in.$kind 60
    dehaze_fails 1 'damaged or incomplete' cut.$kind out.mp4
    [ $kind = ts ] || dehaze_fails 1 'damaged or incomplete' cut.$kind out.y4m
  done
  only_files in.mkv in.avi in.ts in.y4m cut.mkv cut.avi cut.ts cut.y4m
}

case_mkv_that_ends_between_clusters() {
  make_video in.mkv 320x240 4 -cluster_time_limit 500
  # Everything before the fourth cluster: nothing is cut in two, but half of it is missing.
  local offset
  offset=$(LC_ALL=C grep -aboP '\x1f\x43\xb6\x75' in.mkv | sed -n 4p | cut -d: -f1)
  head -c "$offset" in.mkv >cut.mkv
  dehaze_fails 1 'damaged or incomplete' cut.mkv out.mkv
  only_files in.mkv cut.mkv
}

case_overwritten_middle() {
  make_video in.mp4 320x240 2
  cp in.mp4 bad.mp4
  head -c 4000 /dev/urandom | dd of=bad.mp4 bs=1 seek=40000 conv=notrunc status=none
  dehaze_fails 1 'damaged or incomplete' bad.mp4 out.mp4
  only_files in.mp4 bad.mp4
}

# Whatever the bytes, it ends by itself, with a message or a complete file.
case_random_damage() {
  make_picture in.png 160x160
  make_picture in.jpg 160x160 yuvj420p
  make_picture in.webp 160x160 yuv420p
  make_video in.mp4 160x160 0.4
  make_input -f lavfi -i "$(source_video 160x160 0.2)" -pix_fmt yuv420p in.y4m
  RANDOM=7
  local pair kind output i status
  for pair in png:png jpg:png webp:png mp4:y4m y4m:y4m; do
    kind=${pair%:*}
    output=out.${pair#*:}
    for i in $(seq 6); do
      cp "in.$kind" "bad.$kind"
      for _ in 1 2 3; do
        printf "\\x$(printf %02x $((RANDOM % 256)))" |
          dd of="bad.$kind" bs=1 seek=$((RANDOM % $(stat -c %s "in.$kind"))) conv=notrunc status=none
      done
      status=0
      timeout 20 "$DEHAZE" --force "bad.$kind" "$output" >/dev/null 2>messages || status=$?
      [ $status -le 1 ] || fail "status $status for $kind, attempt $i: $(cat messages)"
      [ $status -eq 0 ] || [ ! -e "$output" ] || fail "an output in spite of an error"
      rm -f "$output"
    done
  done
}

case_mp4_that_ends_between_frames() {
  make_input -f lavfi -i "$(source_video 160x160 4)" -c:v libx264 -movflags +faststart in.mp4
  # Everything before the 50th of 100 frames: nothing is cut in two.
  head -c "$(ffprobe -v error -select_streams v -show_entries packet=pos -of csv=p=0 in.mp4 |
    tr -d , | sort -n | sed -n 50p)" in.mp4 >cut.mp4
  dehaze_fails 1 'damaged or incomplete: it ends after [12]\.[0-9] of 4\.0 seconds' cut.mp4 out.mp4
  only_files in.mp4 cut.mp4
}

# The sound of the frames that are wanted lies behind the damage.
case_damage_behind_the_frames() {
  # Each packet of this video is a frame at once.
  make_input -f lavfi -i "$(source_video 160x160 1)" -f lavfi -i sine=duration=1 -pix_fmt yuv420p \
    -c:v rawvideo -c:a pcm_s16le in.avi
  local position size
  IFS=, read -r size position _ <<<"$(ffprobe -v error -select_streams v \
    -show_entries packet=size,pos -of csv=p=0 in.avi | sed -n 10p)"
  head -c $((position + 8 + size + 20)) in.avi >cut.avi
  dehaze_fails 1 'damaged or incomplete: .*--max-frames 10 takes the part' cut.avi out.mkv
  dehaze --max-frames 10 cut.avi out.mkv
  equal "$(frame_times out.mkv | wc -l)" 10 frames
  [ -n "$(stream out.mkv a codec_name)" ] || fail "no sound"
}

run_case "$1"
