#!/usr/bin/env bash
# How much is taken out, and that it stays the same over time.
source "$(dirname "$0")/lib.sh"

# make_hazy FILE SIZE RED GREEN BLUE: grey stripes from black to white, seen through haze of that
# colour which thickens from nothing at the bottom to all there is in the upper quarter.
make_hazy() {
  local t="clip((Y/H-0.25)/0.75\,0\,1)" stripes="255*mod(floor(X/8)\,4)/3"
  make_input -f lavfi -i "color=black:size=$2,format=gbrp" -frames:v 1 \
    -vf "geq=r='$stripes*$t+$3*(1-$t)':g='$stripes*$t+$4*(1-$t)':b='$stripes*$t+$5*(1-$t)',format=rgb24" \
    "$1"
}

strength_of() { "$DEHAZE" --show light "$@" | sed -E 's/.* strength //'; }

# Standard deviation of luma, times 100.
luma_deviation() {
  ffmpeg -nostdin -v error -i "$1" -vf "format=gray,showinfo" -f null - -loglevel info 2>&1 |
    sed -nE 's/.*stdev:\[([0-9.]+).*/\1/p' | awk '{printf "%d\n", $1 * 100}'
}

case_zero_changes_nothing() {
  make_hazy in.png 320x240 205 208 212
  make_input -loop 1 -i in.png -frames:v 3 \
    -vf "scale=out_color_matrix=smpte170m:out_range=full,format=yuv420p" -color_range pc \
    -colorspace smpte170m in.y4m
  dehaze --engine photo --strength 0 in.y4m out.y4m
  says_nothing
  equal "$(frame_digest out.y4m)" "$(frame_digest in.y4m)"
  dehaze --engine photo --strength 0 in.png out.png
  same_picture in.png out.png
  # The other engine says what is left.
  dehaze --engine preview --strength 0 in.y4m preview.y4m
  says 'tone curve'
}

case_grows_with_the_number() {
  make_hazy in.png 320x240 205 208 212
  local engine strength before after
  for engine in photo preview; do
    before=0
    for strength in 0 40 70 100; do
      dehaze --quiet --force --engine $engine --strength $strength in.png out.png
      after=$(luma_deviation out.png)
      [ "$after" -gt "$before" ] || fail "$engine: deviation $after at $strength, $before below"
      before=$after
    done
  done
}

case_auto_tells_haze_from_clear_air() {
  make_hazy hazy.png 320x240 205 208 212
  make_input -i hazy.png -vf "lutrgb=r='40+val*0.75':g='40+val*0.75':b='42+val*0.75'" thick.png
  equal "$(strength_of thick.png)" 100 "strength for thick haze"
  # Full range of values everywhere: nothing to take out.
  make_input -f lavfi -i testsrc2=size=640x480 -frames:v 1 -vf format=rgb24 clear.png
  local strength
  strength=$(strength_of clear.png)
  [ "$strength" -le 20 ] || fail "strength $strength for a clear picture"
  # The preview engine goes by the same measure, to a part of its scale.
  equal "$(strength_of --engine preview thick.png)" 60
  strength=$(strength_of --engine preview clear.png)
  [ "$strength" -le 15 ] || fail "strength $strength for a clear picture"
}

case_bright_grey_things_are_not_haze() {
  # Sky, sand with dark things on its far part, bare sand in front.
  make_input -f lavfi -i "color=0xc8d8e8:size=640x480,format=rgb24" -frames:v 1 \
    -vf "drawbox=y=160:h=320:color=0x786c58:t=fill,drawgrid=y=160:w=40:h=400:t=3:color=0x100c08,
      drawbox=y=0:h=158:color=0xc8d8e8:t=fill,drawbox=y=300:h=180:color=0x786c58:t=fill" sand.png
  local strength
  strength=$(strength_of sand.png)
  [ "$strength" -le 5 ] || fail "strength $strength for a beach in clear air"
  # The same through haze.
  make_input -i sand.png -vf "lutrgb=r='70+val*0.65':g='70+val*0.65':b='70+val*0.65'" veiled.png
  equal "$(strength_of veiled.png)" 100
}

case_grey_walls_are_not_haze() {
  # Sky over grey walls with small dark windows.
  local window="gt(Y\,130)*lt(mod(X\,80)\,10)*lt(mod(Y\,60)\,10)"
  make_input -f lavfi -i "color=0xc8d8e8:size=640x480,format=rgb24" -frames:v 1 \
    -vf "drawbox=y=120:h=360:color=0x848280:t=fill,
      geq=r='if($window\,10\,r(X\,Y))':g='if($window\,12\,g(X\,Y))':b='if($window\,14\,b(X\,Y))'" wall.png
  local strength veil value least most
  strength=$(strength_of wall.png)
  [ "$strength" -le 5 ] || fail "strength $strength in clear air"
  # The windows show how thin the veil is, where the walls alone would be taken for thick haze.
  for veil in 15:1:20 30:20:70 60:100:100; do
    IFS=: read -r value least most <<<"$veil"
    make_input -i wall.png -vf "lutrgb=r='$value+val*(1-$value/210)':g='$value+val*(1-$value/210)':b='$value+val*(1-$value/210)'" \
      veiled.png
    strength=$(strength_of veiled.png)
    [ "$strength" -ge "$least" ] && [ "$strength" -le "$most" ] ||
      fail "strength $strength through a veil of $value"
  done
}

case_black_things_do_not_hide_the_haze() {
  make_hazy hazy.png 640x480 205 208 212
  make_input -i hazy.png -vf "lutrgb=r='40+val*0.75':g='40+val*0.75':b='42+val*0.75'" thick.png
  equal "$(strength_of thick.png)" 100
  make_input -i thick.png -vf "drawbox=y=430:h=50:color=0x101010:t=fill" front.png
  equal "$(strength_of front.png)" 100 "behind something black in front"
  make_input -i thick.png -vf "pad=640:640:0:80" bars.png
  equal "$(strength_of bars.png)" 100 "between bars"
}

case_far_haze_counts() {
  # Nothing hazy at the bottom, where the stripes are black, and all haze at the top.
  make_hazy hazy.png 640x480 205 208 212
  equal "$(strength_of hazy.png)" 100
  # The same lying on its side, with a tag that says so.
  make_input -i hazy.png -vf transpose=clock -q:v 1 -pix_fmt yuvj444p plain.jpg
  exif_jpeg plain.jpg turned.jpg 8
  equal "$(strength_of turned.jpg)" 100
}

case_a_dark_thing_is_no_light() {
  # No sky, no distance, nothing bright.
  make_input -f lavfi -i color=0x484440:size=640x480 -frames:v 1 \
    -vf "drawgrid=w=40:h=40:t=6:color=0x281c18,format=rgb24" dark.png
  equal "$(strength_of dark.png)" 5
}

luma_median() {
  ffmpeg -nostdin -v error -i "$1" -vf "format=gray" -f rawvideo - | od -An -v -w1 -tu1 | sort -n |
    awk '{ value[NR] = $1 } END { print value[int((NR + 1) / 2)] + 0 }'
}

case_half_of_the_picture_stays_bright_enough() {
  # A dark wood below a bright cloud.
  make_input -f lavfi -i color=0xc8ccac:size=320x240 -frames:v 1 \
    -vf "drawbox=y=60:h=180:color=0x404248:t=fill,drawgrid=y=60:w=16:h=300:t=6:color=0x343438,
      drawbox=h=58:color=0xc8ccac:t=fill,format=rgb24" wood.png
  dehaze wood.png auto.png
  dehaze --strength 100 wood.png all.png
  local median
  median=$(luma_median auto.png)
  [ "$median" -ge 33 ] && [ "$median" -le 40 ] || fail "median $median"
  median=$(luma_median all.png)
  [ "$median" -lt 30 ] || fail "median $median with all taken out"
}

# Mean of a channel over the lower half, where there is something to see.
channel_mean() { # FILE CHANNEL
  ffmpeg -nostdin -v error -i "$1" -vf "crop=iw:ih/2:0:ih/2,extractplanes=$2,scale=1:1:flags=area" \
    -f rawvideo - | od -An -tu1 | tr -d ' '
}

case_coloured_light_is_taken_out() {
  make_hazy in.png 640x480 226 196 150
  "$DEHAZE" --show light in.png |
    holds '^light 22[4-8] 19[4-8] 1(4[89]|5[012]) strength' || fail "$("$DEHAZE" --show light in.png)"
  dehaze in.png out.png
  local before after
  before=$(($(channel_mean in.png r) - $(channel_mean in.png b)))
  after=$(($(channel_mean out.png r) - $(channel_mean out.png b)))
  # The stripes are grey.
  [ $((after * 2)) -lt "$before" ] || fail "red less blue: $before before, $after after"
}

case_light_is_looked_for_upwards() {
  # Haze above, something whiter below; upright, and stored the other way up with a tag.
  make_input -f lavfi -i color=0xa0a8b0:size=320x240 -frames:v 1 \
    -vf "drawbox=y=150:h=90:color=0xd0d0d0:t=fill,drawbox=y=100:h=50:color=0x303030:t=fill" up.png
  make_input -loop 1 -i up.png -frames:v 5 -pix_fmt yuv420p -c:v libx264 -qp 10 up.mp4
  make_input -loop 1 -i up.png -frames:v 5 -vf hflip,vflip -pix_fmt yuv420p -c:v libx264 -qp 10 \
    down.mp4
  make_input -i down.mp4 -c copy -metadata:s:v rotate=180 turned.mp4
  local file
  for file in up turned; do
    "$DEHAZE" --engine photo --show light $file.mp4 | holds '^light 1[56].* ' ||
      fail "$file: $("$DEHAZE" --engine photo --show light $file.mp4)"
  done
}

# Root of the mean square of the change of mean luma from frame to frame.
flicker() {
  ffmpeg -nostdin -v error -i "$1" \
    -vf "signalstats,metadata=print:key=lavfi.signalstats.YAVG:file=-" -f null - |
    sed -nE 's/.*YAVG=//p' |
    awk 'NR > 1 { sum += ($1 - last) ^ 2 } { last = $1 } END { printf "%.4f\n", sqrt(sum / (NR - 1)) }'
}

case_still_video_does_not_flicker() {
  make_hazy in.png 640x480 205 208 212
  make_input -loop 1 -i in.png -frames:v 60 -r 25 -vf "format=yuv420p,noise=alls=12:allf=t" in.y4m
  local engine rms
  for engine in photo preview; do
    dehaze --engine $engine in.y4m $engine.y4m
    equal "$(frame_times $engine.y4m | wc -l)" 60 frames
    rms=$(flicker $engine.y4m)
    awk "BEGIN { exit !($rms > 0 && $rms < 0.05) }" || fail "$engine: RMS $rms"
  done
}

case_cut_starts_anew() {
  # The second scene must look as it does alone.
  make_hazy a.png 320x240 205 208 212
  make_hazy b.png 320x240 120 100 80
  local scene
  for scene in a b; do
    make_input -loop 1 -i $scene.png -frames:v 10 -r 25 -vf format=yuv420p $scene.y4m
  done
  make_input -i a.y4m -i b.y4m -filter_complex concat ab.y4m
  dehaze --engine photo ab.y4m ab_out.y4m
  dehaze --engine photo b.y4m b_out.y4m
  equal "$(frame_digest ab_out.y4m | tail -n 10 | cut -d, -f6)" \
    "$(frame_digest b_out.y4m | cut -d, -f6)"
}

run_case "$1"
