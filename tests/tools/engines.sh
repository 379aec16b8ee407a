#!/usr/bin/env bash
# The two engines: which one runs, and what they show.
source "$(dirname "$0")/lib.sh"

case_default_engine() {
  make_picture in.png 320x240
  dehaze in.png default.png
  dehaze --engine photo in.png photo.png
  dehaze --engine preview in.png preview.png
  same_picture default.png photo.png
  different_pictures default.png preview.png 40
  # A video that fits goes the fast way, one that does not keeps its size.
  make_video in.mp4 320x240 0.2
  dehaze in.mp4 default.y4m
  dehaze --engine preview in.mp4 preview.y4m
  dehaze --engine photo in.mp4 photo.y4m
  equal "$(frame_digest default.y4m)" "$(frame_digest preview.y4m)"
  [ "$(frame_digest default.y4m)" != "$(frame_digest photo.y4m)" ] || fail "equal engines"
  local size
  for size in 1282x240 320x722 126x240; do
    make_video in.mp4 $size 0.08
    dehaze --force in.mp4 out.mp4
    says_nothing
    equal "$(stream out.mp4 v width,height)" "${size/x/,}"
  done
}

case_level_means_preview() {
  make_picture in.png 320x240
  dehaze --level 10 in.png level.png
  dehaze --engine preview --level 10 in.png preview.png
  same_picture level.png preview.png
  dehaze --engine preview --strength 50 in.png strength.png
  same_picture strength.png preview.png
}

case_large_pictures_keep_their_size() {
  local size
  for size in 1921x1080 1080x1921 2600x30 30x2600; do
    make_picture in.png $size
    dehaze --force in.png out.png
    says_nothing
    equal "$(stream out.png v width,height)" "${size/x/,}"
  done
}

case_small_pictures() {
  local size
  for size in 8x8 9x8 8x11 17x9 31x33; do
    make_picture in.png $size
    dehaze --force in.png out.png
    equal "$(stream out.png v width,height)" "${size/x/,}"
  done
}

case_show_compare() {
  make_picture in.png 640x480
  local engine
  for engine in photo preview; do
    dehaze --force --engine $engine in.png out.png
    # What the haze removal leaves out: the way to 4:2:0 and back.
    dehaze --force --engine $engine --show compare in.png compare.png
    make_input -i in.png -vf crop=312:480:0:0 want_left.png
    make_input -i compare.png -vf crop=312:480:0:0 left.png
    close_pictures left.png want_left.png 30
    make_input -i out.png -vf crop=312:480:328:0 want_right.png
    make_input -i compare.png -vf crop=312:480:328:0 right.png
    same_picture right.png want_right.png
    # The line; its chroma is mixed with that of its neighbours on the way from 4:2:0.
    make_input -i compare.png -vf crop=2:480:319:0,format=gray -f rawvideo line.raw
    equal "$(tr -d '\360-\377' <line.raw | wc -c)" 0 "line samples that are not white"
    rm line.raw left.png right.png want_left.png want_right.png
  done
}

case_show_map() {
  # Grey like the haze in the upper half, dark in the lower one.
  make_input -f lavfi -i color=0xc8c8c8:size=320x240 -frames:v 1 \
    -vf "drawbox=y=120:h=120:color=0x202020:t=fill,format=rgb24" in.png
  local engine
  for engine in photo preview; do
    dehaze --force --engine $engine --show map in.png map.png
    make_input -i map.png -vf "crop=320:40:0:0,scale=1:1,format=gray" -f rawvideo -y upper
    make_input -i map.png -vf "crop=320:40:0:200,scale=1:1,format=gray" -f rawvideo -y lower
    local upper lower
    upper=$(od -An -tu1 upper) lower=$(od -An -tu1 lower)
    [ "$upper" -lt "$lower" ] || fail "$engine: $upper is not below $lower"
    # Grey: red equals blue.
    make_input -y -i map.png -vf extractplanes=r red.png
    make_input -y -i map.png -vf extractplanes=b blue.png
    same_picture red.png blue.png
  done
}

case_show_light() {
  make_input -f lavfi -i color=0xc8b496:size=320x240 -frames:v 1 \
    -vf "drawbox=y=120:h=120:color=0x202020:t=fill,format=rgb24" in.png
  # The colour of the upper half, 4:2:0 and its rounding apart.
  "$DEHAZE" --show light in.png >light
  holds '^light (199|200|201) (179|180|181) (149|150|151) strength [0-9]+$' <light ||
    fail "$(cat light)"
  # With an output the result is written too.
  "$DEHAZE" --show light in.png out.png >both
  cmp light both
  dehaze in.png want.png
  same_picture out.png want.png
  make_video in.mp4 320x240 2
  "$DEHAZE" --show light in.mp4 >light
  equal "$(wc -l <light)" 1 lines
  "$DEHAZE" --show light --max-frames 5 --engine photo in.mp4 >light
  equal "$(wc -l <light)" 1 lines
}

run_case "$1"
