#!/usr/bin/env bash
# One picture in, one picture out.
source "$(dirname "$0")/lib.sh"

# in.KIND to each kind of picture.
check_all_kinds_from() {
  local pair
  for pair in jpg:mjpeg jpeg:mjpeg png:png webp:webp; do
    dehaze --level 20 "$1" "out.${pair%:*}"
    says_nothing
    equal "$(stream "out.${pair%:*}" v codec_name,width,height)" "${pair#*:},320,240"
    different_pictures "$1" "out.${pair%:*}" 35
  done
  # The same frame, whatever it is stored as.
  close_pictures out.png out.jpg 30
  close_pictures out.png out.webp 25
  same_picture out.jpg out.jpeg
}

case_from_jpeg() {
  make_picture in.jpg 320x240 yuvj420p
  check_all_kinds_from in.jpg
}

case_from_png() {
  make_picture in.png 320x240
  check_all_kinds_from in.png
}

case_from_webp() {
  make_picture in.webp 320x240 yuv420p
  check_all_kinds_from in.webp
}

case_levels_differ() {
  make_picture in.png 320x240
  dehaze --level 0 in.png weak.png
  dehaze --level 60 in.png strong.png
  different_pictures weak.png strong.png 30
  # The contrast grows with the level.
  local weak strong
  weak=$(luma_deviation weak.png)
  strong=$(luma_deviation strong.png)
  [ "$strong" -gt "$weak" ] || fail "deviation $weak at level 0, $strong at level 60"
}

# Standard deviation of luma, times 100.
luma_deviation() {
  ffmpeg -nostdin -v error -i "$1" -vf "format=gray,showinfo" -f null - -loglevel info 2>&1 |
    sed -nE 's/.*stdev:\[([0-9.]+).*/\1/p' | awk '{printf "%d\n", $1 * 100}'
}

case_same_every_time() {
  make_picture in.png 320x240
  dehaze in.png a.png
  dehaze in.png b.png
  cmp a.png b.png
}

case_content_decides_not_the_name() {
  make_picture in.png 320x240
  cp in.png in.jpg
  cp in.png 'http:name with spaces%03d'
  dehaze in.png a.png
  dehaze in.jpg b.png
  dehaze 'http:name with spaces%03d' c.png
  same_picture a.png b.png
  same_picture a.png c.png
}

# Phones append a video to a picture.
case_data_after_the_picture() {
  make_picture in.jpg 160x160 yuvj420p
  dehaze in.jpg want.png
  head -c 20000 /dev/urandom | cat in.jpg - >long.jpg
  dehaze long.jpg out.png
  same_picture out.png want.png
}

case_awkward_output_names() {
  make_picture in.png 160x160
  local long
  long=$(printf 'n%.0s' $(seq 251)).png
  local name
  for name in 'a b%03d.png' 'tcp:x.png' "$long"; do
    dehaze in.png "./$name"
    [ -s "$name" ] || fail "no $name"
  done
  dehaze -- in.png -dash.png
  [ -s ./-dash.png ] || fail "no -dash.png"
}

# The result of an odd size is that of the picture with its last column and row repeated.
case_odd_size() {
  make_picture in.png 641x481
  make_input -i in.png -vf "format=gbrp,pad=642:482,fillborders=right=1:bottom=1:mode=smear,format=rgb24" \
    even.png
  dehaze in.png out.png
  dehaze even.png even_out.png
  make_input -i even_out.png -vf crop=641:481:0:0 want.png
  same_picture out.png want.png
  local kind
  for kind in jpg webp; do
    dehaze in.png "out.$kind"
    equal "$(stream "out.$kind" v width,height)" 641,481
  done
}

case_odd_size_420() {
  make_picture in.jpg 321x241 yuvj420p
  make_picture in.webp 321x241 yuv420p
  local from to
  for from in jpg webp; do
    for to in png jpg webp; do
      dehaze --force --level 10 "in.$from" "out.$to"
      equal "$(stream "out.$to" v width,height)" 321,241
      close_pictures out.png "out.$to" 25
    done
  done
}

case_smallest_size() {
  make_picture in.png 128x128
  dehaze in.png out.png
  equal "$(stream out.png v width,height)" 128,128
}

case_too_small() {
  local size
  for size in 127x200 200x127 1x1; do
    make_picture in.png $size
    dehaze_fails 1 "the picture is ${size/x/ x }.*at least 128 x 128" --engine preview in.png out.png
  done
  for size in 7x100 100x7 1x1; do
    make_picture in.png $size
    dehaze_fails 1 "the picture is ${size/x/ x }.*at least 8 x 8" in.png out.png
  done
  only_files in.png
}

case_too_large() {
  make_picture in.png 1921x1080
  dehaze --engine preview in.png out.png
  says 'scaled down from 1921 x 1080 to 1280 x 720'
  equal "$(stream out.png v width,height)" 1280,720
  # Portrait: at most 720 rows.
  make_picture in.png 1080x1920
  dehaze --engine preview --force in.png out.png
  equal "$(stream out.png v width,height)" 406,720
  make_picture in.png 1280x721
  dehaze --engine preview --force in.png out.png
  equal "$(stream out.png v width,height)" 1278,720
  make_picture in.png 1280x720
  dehaze --engine preview --force in.png out.png
  says_nothing
  equal "$(stream out.png v width,height)" 1280,720
}

case_too_large_at_all() {
  make_input -f lavfi -i color=gray:size=32770x16 -frames:v 1 -pix_fmt gray in.pgm
  dehaze_fails 1 'the picture is 32770 x 16; .* no side above 32768, so reduce it' \
    --engine photo in.pgm out.png
  make_input -f lavfi -i color=gray:size=16000x8400 -frames:v 1 -pix_fmt gray in.pgm
  dehaze_fails 1 'the picture is 16000 x 8400; .* at most 134 megapixels' --engine photo in.pgm out.png
  only_files in.pgm
}

# The scaled picture is that of the input scaled by somebody else.
case_scaled_content() {
  make_picture in.png 1920x1080
  make_input -i in.png -vf scale=1280:720:flags=spline+accurate_rnd+full_chroma_int small.png
  dehaze --level 10 in.png out.png
  dehaze --level 10 small.png want.png
  close_pictures out.png want.png 32
}

case_too_narrow() {
  make_picture in.png 4000x300
  dehaze_fails 1 'too long and narrow' --engine preview in.png out.png
  only_files in.png
}

case_grey() {
  make_picture in.png 320x240 gray
  dehaze in.png out.png
  make_input -i out.png -vf extractplanes=r red.png
  make_input -i out.png -vf extractplanes=b blue.png
  same_picture red.png blue.png
  make_picture in.jpg 320x240 gray
  dehaze in.jpg out.jpg
  close_pictures out.png out.jpg 30
}

case_palette() {
  make_picture rgb.png 320x240 rgb8
  make_input -i rgb.png -vf format=rgb24 in.png
  make_input -i rgb.png -pix_fmt pal8 -vf "split[a][b];[a]palettegen[p];[b][p]paletteuse=dither=none" \
    palette.png
  equal "$(stream palette.png v pix_fmt)" pal8
  dehaze palette.png out.png
  dehaze in.png want.png
  close_pictures out.png want.png 30
}

alpha_of() { make_input -i "$1" -vf "format=rgba,alphaextract,format=gray" "$2"; }

case_transparency() {
  make_picture opaque.png 321x240
  make_input -i opaque.png -filter_complex \
    "split[a][b];[a]format=rgba[color];[b]format=gray,geq=lum=mod(X\,256)[alpha];[color][alpha]alphamerge" \
    in.png
  alpha_of in.png want_alpha.png
  dehaze opaque.png want.jpg
  local kind
  for kind in png webp; do
    dehaze in.png "out.$kind"
    says_nothing
    alpha_of "out.$kind" alpha.png
    same_picture alpha.png want_alpha.png
  done
  dehaze in.png out.jpg
  says 'JPEG has no transparency'
  same_picture out.jpg want.jpg
}

case_transparency_scaled_down() {
  make_input -f lavfi -i testsrc2=size=1600x900 -frames:v 1 \
    -vf "format=rgba,geq=r=r(X\,Y):g=g(X\,Y):b=b(X\,Y):a=min(255\,X/4)" in.png
  make_input -i in.png -vf "alphaextract,format=gray,scale=1280:720:flags=bicubic" want_alpha.png
  local kind
  for kind in png webp; do
    dehaze --engine preview in.png "out.$kind"
    equal "$(stream "out.$kind" v width,height)" 1280,720
    alpha_of "out.$kind" alpha.png
    close_pictures alpha.png want_alpha.png 50
  done
}

# JPEG is full range, whatever its chroma looks like.
case_every_subsampling_of_jpeg() {
  make_picture sharp.png 320x240
  make_input -i sharp.png -vf gblur=6 in.png
  dehaze in.png want.png
  local format
  for format in yuvj420p yuvj422p yuvj444p; do
    make_input -i in.png -vf "zscale=m=170m:r=full:f=spline36,format=$format" -q:v 2 in.jpg
    equal "$(stream in.jpg v pix_fmt)" $format
    dehaze --force in.jpg out.png
    close_pictures out.png want.png 34
  done
}

case_sixteen_bit() {
  make_picture in16.png 320x240 rgb48be
  make_picture in8.png 320x240 rgb24
  dehaze --level 10 in16.png out16.png
  says '16-bit input is converted to 8 bits'
  dehaze --level 10 in8.png out8.png
  close_pictures out8.png out16.png 32
  equal "$(stream out16.png v pix_fmt)" rgb24
}

case_first_frame_of_a_video() {
  make_input -f lavfi -i "$(source_video 320x240 0.4)" -vf "$kHaze,format=yuv420p" in.y4m
  make_input -i in.y4m -frames:v 1 first.y4m
  dehaze in.y4m out.png
  says 'its first frame becomes the picture'
  dehaze first.y4m want.png
  same_picture out.png want.png
}

run_case "$1"
