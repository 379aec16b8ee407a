#!/usr/bin/env bash
# Pictures with more colour than 4:2:0 holds.
source "$(dirname "$0")/lib.sh"

# make_columns FILE SIZE: red and green columns of one pixel each, through haze that thickens from
# nothing at the bottom to all there is in the upper quarter; some things are black.
make_columns() {
  local t="clip((Y/H-0.25)/0.75\,0\,1)" lit="lt(mod(floor(X/8)\,4)\,3)"
  make_input -f lavfi -i "color=black:size=$2,format=gbrp" -frames:v 1 \
    -vf "geq=r='220*mod(X\,2)*$lit*$t+205*(1-$t)':g='150*mod(X+1\,2)*$lit*$t+208*(1-$t)':b='212*(1-$t)',format=rgb24" \
    "$1"
}

# Mean distance in red between neighbouring columns of a part of the picture, times 100.
column_contrast() { # FILE CROP
  ffmpeg -nostdin -v error -i "$1" -vf "crop=$2,extractplanes=r" -f rawvideo - | od -An -v -w2 -tu1 |
    awk '{ sum += ($2 - $1) ^ 2 } END { printf "%d\n", 100 * sqrt(sum / NR) }'
}

case_nothing_is_lost_without_haze_removal() {
  make_picture in.png 321x241
  dehaze --strength 0 in.png out.png
  says_nothing
  same_picture out.png in.png
  dehaze --strength 0 in.png out.jpg
  make_input -i in.png -q:v 2 -pix_fmt yuvj444p want.jpg
  close_pictures out.jpg want.jpg 45
  make_input -i in.png -q:v 2 -pix_fmt yuvj444p in.jpg
  dehaze --force --strength 0 in.jpg out.png
  close_pictures out.png in.jpg 50
}

case_fine_colours_gain_contrast() {
  make_columns in.png 320x240
  dehaze in.png out.png
  dehaze --engine preview in.png preview.png
  local before after
  before=$(column_contrast in.png 240:40:0:130)
  after=$(column_contrast out.png 240:40:0:130)
  [ $((after * 5)) -gt $((before * 6)) ] || fail "contrast $before before, $after after"
  after=$(column_contrast preview.png 240:40:0:130)
  [ "$after" -lt "$before" ] || fail "the preview engine is not what a camera's screen shows"
}

case_jpeg_has_the_chroma_of_the_input() {
  make_picture in.png 320x240
  make_input -i in.png -q:v 2 -pix_fmt yuvj420p in420.jpg
  make_input -i in.png -q:v 2 -pix_fmt yuvj422p in422.jpg
  make_picture grey.png 320x240 gray
  local input
  for input in in.png:yuvj444p in420.jpg:yuvj420p in422.jpg:yuvj444p grey.png:yuvj420p; do
    dehaze --force "${input%:*}" out.jpg
    equal "$(stream out.jpg v pix_fmt)" "${input#*:}" "$input"
  done
  dehaze --force --engine preview in.png out.jpg
  equal "$(stream out.jpg v pix_fmt)" yuvj420p
}

case_turned() {
  make_picture in.png 321x241
  make_input -i in.png -q:v 2 -pix_fmt yuvj444p plain.jpg
  exif_jpeg plain.jpg in.jpg 6
  dehaze --strength 0 in.jpg out.png
  make_input -i plain.jpg -vf "format=rgb24,transpose=clock" want.png
  close_pictures out.png want.png 50
}

case_views() {
  make_columns in.png 322x240
  dehaze in.png whole.png
  dehaze --show compare in.png compare.png
  # Next to the line chroma is a mean with its own.
  local file
  for file in in compare whole; do
    make_input -i $file.png -vf crop=150:240:0:0 ${file}_left.png
    make_input -i $file.png -vf crop=150:240:172:0 ${file}_right.png
  done
  same_picture compare_left.png in_left.png
  same_picture compare_right.png whole_right.png
  different_pictures compare_right.png in_right.png 30
  local darkest
  darkest=$(ffmpeg -nostdin -v error -i compare.png -vf crop=2:240:160:0 -f rawvideo -pix_fmt rgb24 - |
    od -An -v -w1 -tu1 | sort -n | first_lines 1)
  [ "$darkest" -ge 230 ] || fail "$darkest in the white line"
  dehaze --show map in.png map.png
  local channel
  for channel in r g b; do make_input -i map.png -vf extractplanes=$channel $channel.png; done
  same_picture r.png b.png
  same_picture r.png g.png
}

# A chroma sample for four columns, and for four columns and rows.
case_coarse_chroma_of_any_size() {
  make_picture sharp.png 321x241
  make_input -i sharp.png -vf gblur=8 in.png
  local format
  for format in yuv411p yuv410p; do
    make_input -i in.png -pix_fmt $format in.tiff
    equal "$(stream in.tiff v pix_fmt)" $format
    dehaze --force --strength 0 in.tiff out.png
    close_pictures out.png in.png 34
  done
}

case_palettes_and_few_bits() {
  make_picture in.png 320x240
  make_input -i in.png -filter_complex "split[a][b];[a]palettegen[p];[b][p]paletteuse" palette.png
  equal "$(stream palette.png v pix_fmt)" pal8
  dehaze --strength 0 palette.png out.png
  same_picture out.png palette.png
  # Full values stay full ones.
  local format
  for format in rgb565le rgb555le; do
    make_input -f lavfi -i color=white:size=160x160 -frames:v 1 -c:v bmp -pix_fmt $format in.bmp
    equal "$(stream in.bmp v pix_fmt)" $format
    dehaze --force --strength 0 in.bmp out.png
    equal "$(ffmpeg -nostdin -v error -i out.png -f rawvideo -pix_fmt rgb24 - | od -An -v -w1 -tu1 |
      sort -u | tr -d ' ')" 255
  done
}

run_case "$1"
