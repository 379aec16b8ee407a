#!/usr/bin/env bash
# Video files: what is kept besides the picture.
source "$(dirname "$0")/lib.sh"

color_tags() {
  stream "$1" v:0 color_range,color_space,color_transfer,color_primaries,chroma_location
}

# Everything that should survive, whichever the two containers are.
check_kept() { # IN OUT
  equal "$(frame_times "$2")" "$(frame_times "$1")" "time stamps"
  equal "$(stream "$2" v:0 r_frame_rate)" "$(stream "$1" v:0 r_frame_rate)" "frame rate"
  equal "$(stream "$2" v:0 sample_aspect_ratio)" "$(stream "$1" v:0 sample_aspect_ratio)" SAR
  equal "$(color_tags "$2")" "$(color_tags "$1")" "colour tags"
  equal "$(stream "$2" v:0 width,height,codec_name,pix_fmt)" h264,320,240,yuv420p "video stream"
}

make_rich_video() { # FILE
  make_input -f lavfi -i "$(source_video 320x240 1 30000/1001)" -f lavfi -i sine=440:duration=1 \
    -f lavfi -i sine=880:duration=1 -map 0 -map 1 -map 2 \
    -vf "$kHaze,scale=out_color_matrix=bt709:out_range=limited,format=yuv420p,setsar=8/9" \
    -color_range tv -colorspace bt709 -color_primaries bt709 -color_trc bt709 \
    -c:v libx264 -preset ultrafast -c:a aac -metadata title="Grey street" \
    -metadata:s:a:1 language=fra "$1"
}

check_rich() { # IN OUT
  check_kept "$1" "$2"
  equal "$(audio_digest "$2" 0)" "$(audio_digest "$1" 0)" "first audio track"
  equal "$(audio_digest "$2" 1)" "$(audio_digest "$1" 1)" "second audio track"
  equal "$(ffprobe -v error -show_entries format_tags=title -of csv=p=0 "$2")" "Grey street" title
  equal "$(ffprobe -v error -select_streams a:1 -show_entries stream_tags=language -of csv=p=0 "$2")" \
    fra language
}

audio_times() {
  ffprobe -v error -select_streams a -show_entries packet=pts_time -of csv=p=0 "$1" | sort -n
}

case_mp4() {
  make_rich_video in.mp4
  dehaze in.mp4 out.mp4
  says_nothing
  check_rich in.mp4 out.mp4
  equal "$(audio_times out.mp4)" "$(audio_times in.mp4)" "time stamps of the audio"
  # The index comes before the data.
  local order
  order=$(grep -abo -e moov -e mdat out.mp4 | first_lines 1)
  equal "${order#*:}" moov "first part"
}

case_mov() {
  make_rich_video in.mov
  dehaze in.mov out.mov
  check_rich in.mov out.mov
}

case_mkv() {
  make_rich_video in.mkv
  dehaze in.mkv out.mkv
  says_nothing
  check_rich in.mkv out.mkv
  equal "$(audio_times out.mkv)" "$(audio_times in.mkv)" "time stamps of the audio"
}

case_mp4_to_mkv_and_back() {
  make_rich_video in.mp4
  dehaze in.mp4 out.mkv
  equal "$(audio_digest out.mkv 0)" "$(audio_digest in.mp4 0)" audio
  equal "$(color_tags out.mkv)" "$(color_tags in.mp4)" "colour tags"
  dehaze out.mkv back.mp4
  check_rich out.mkv back.mp4
}

case_transport_stream() {
  make_video in.ts 320x240 1
  dehaze in.ts out.mp4
  equal "$(frame_times out.mp4 | wc -l)" 25 frames
  # It starts at 1.4 seconds; a file starts at 0.
  local start
  start=$(ffprobe -v error -show_entries format=start_time -of csv=p=0 out.mp4)
  equal "${start%%.*}" 0 start
}

case_starts_between_key_frames() {
  make_input -f lavfi -i "$(source_video 320x240 2)" -pix_fmt yuv420p -c:v mpeg2video -g 25 -bf 0 \
    -q:v 4 whole.ts
  tail -c +60161 whole.ts >in.ts # a whole number of 188-byte packets
  dehaze in.ts out.mp4
  local frames
  frames=$(frame_times out.mp4 | wc -l)
  if [ "$frames" -lt 20 ] || [ "$frames" -ge 50 ]; then fail "$frames frames"; fi
}

case_variable_frame_rate() {
  make_input -f lavfi -i "$(source_video 320x240 3)" \
    -vf "$kHaze,format=yuv420p,select=not(mod(n\,7)*mod(n\,3))" -vsync vfr -c:v libx264 \
    -preset ultrafast in.mp4
  local kind
  for kind in mp4 mov mkv; do
    dehaze in.mp4 out.$kind
    equal "$(frame_times out.$kind)" "$(frame_times in.mp4)" "time stamps in $kind"
  done
  equal "$(stream out.mp4 v duration)" "$(stream in.mp4 v duration)" duration
  dehaze in.mp4 out.y4m
  says 'Y4M holds no time stamps'
  equal "$(frame_times out.y4m | wc -l)" "$(frame_times in.mp4 | wc -l)" frames
}

case_full_range() {
  make_input -f lavfi -i "$(source_video 320x240 0.2)" \
    -vf "$kHaze,scale=out_range=full,format=yuvj420p" -c:v libx264 -preset ultrafast in.mp4
  dehaze in.mp4 out.mp4
  equal "$(stream out.mp4 v pix_fmt,color_range)" "$(stream in.mp4 v pix_fmt,color_range)" range
  equal "$(stream out.mp4 v color_range)" pc range
}

case_ten_bit() {
  make_input -f lavfi -i "$(source_video 320x240 0.2)" -vf "$kHaze,format=yuv420p10le" \
    -colorspace bt2020nc -color_primaries bt2020 -color_trc bt2020-10 -color_range tv -c:v ffv1 in.mkv
  dehaze in.mkv out.mkv
  says '10-bit input is converted to 8 bits'
  equal "$(stream out.mkv v pix_fmt)" yuv420p
  equal "$(color_tags out.mkv | cut -d, -f1-4)" tv,bt2020nc,bt2020-10,bt2020
}

# The same scene, stored in different ways, is the same scene to the library: lossless video in
# each range and matrix, tagged as such, against the RGB picture it was made from.
case_colors_mean_the_same() {
  make_picture scene.png 320x240
  # Smooth, so that subsampling plays no part.
  make_input -i scene.png -vf gblur=6 in.png
  dehaze --level 10 in.png want.png
  local matrix range
  for matrix in 709:bt709 470bg:bt470bg 2020_ncl:bt2020nc; do
    for range in limited:tv full:pc; do
      make_input -i in.png -frames:v 1 -c:v ffv1 -colorspace "${matrix#*:}" -color_range "${range#*:}" \
        -vf "format=gbrp,zscale=m=${matrix%:*}:r=${range%:*}:c=left:f=spline36,format=yuv420p" in.mkv
      dehaze --force --level 10 in.mkv out.png
      close_pictures out.png want.png 38
      # And back into the range and matrix that the tags say.
      dehaze --force --level 10 in.mkv out.mkv
      make_input -i out.mkv -frames:v 1 \
        -vf "zscale=min=${matrix%:*}:rin=${range%:*}:m=gbr:r=full:f=spline36,format=gbrp,format=rgb24" \
        back.png
      close_pictures back.png want.png 36
    done
  done
}

# Full range is full range in every format, also those that are converted on the way.
case_full_range_of_other_formats() {
  make_picture sharp.png 320x240
  make_input -i sharp.png -vf gblur=6 in.png
  dehaze --level 10 in.png want.png
  local format
  for format in yuv440p yuv422p yuva420p yuv420p10le; do
    make_input -i in.png -frames:v 1 -c:v ffv1 -color_range pc -colorspace smpte170m \
      -vf "zscale=m=170m:r=full:f=spline36,format=yuv444p,scale=in_range=full:out_range=full,format=$format" in.mkv
    equal "$(stream in.mkv v pix_fmt,color_range)" $format,pc
    dehaze --force --level 10 in.mkv out.png
    close_pictures out.png want.png 34
  done
}

case_rgb_video() {
  make_input -f lavfi -i "$(source_video 320x240 0.2)" -vf "$kHaze,gblur=4,format=bgr0" -c:v ffv1 in.mkv
  make_input -i in.mkv -frames:v 1 -vf format=rgb24 in.png
  dehaze --level 10 in.mkv out.mkv
  equal "$(stream out.mkv v pix_fmt,color_range,color_space)" yuv420p,tv,smpte170m
  dehaze --level 10 in.png want.png
  make_input -i out.mkv -frames:v 1 \
    -vf "zscale=min=170m:rin=limited:m=gbr:r=full:f=spline36,format=gbrp,format=rgb24" got.png
  close_pictures got.png want.png 32
}

rotation_of() {
  ffprobe -v error -show_entries stream_side_data=rotation -of csv=p=0 "$1" | tr -d '\n'
}

case_rotation() {
  make_video flat.mp4 320x200 0.2
  local angle
  for angle in 90 180 270; do
    make_input -i flat.mp4 -c copy -metadata:s:v rotate=$angle in.mp4
    [ -n "$(rotation_of in.mp4)" ] || fail "ffmpeg made no rotated input"
    dehaze --force in.mp4 out.mp4
    equal "$(rotation_of out.mp4)" "$(rotation_of in.mp4)" rotation
    equal "$(stream out.mp4 v width,height)" 320,200
    # What cannot carry the tag gets turned pixels.
    dehaze --force in.mp4 out.y4m
    dehaze --force in.mp4 out.mkv
    local size=200,320
    [ $angle != 180 ] || size=320,200
    equal "$(stream out.y4m v width,height)" "$size"
    equal "$(stream out.mkv v width,height)" "$size"
    # ffmpeg turns the MP4 as the tag says.
    make_input -i out.mp4 -frames:v 1 turned.png
    make_input -i out.y4m -frames:v 1 pixels.png
    close_pictures pixels.png turned.png 28
  done
}

case_odd_size() {
  make_input -f lavfi -i "$(source_video 640x480 0.2)" -vf "$kHaze,scale=321:241,format=yuv444p" \
    -c:v ffv1 in.mkv
  dehaze in.mkv out.mp4
  says 'H.264 needs an even size.* 322 x 242'
  equal "$(stream out.mp4 v width,height)" 322,242
  dehaze in.mkv out.y4m
  says_nothing
  equal "$(stream out.y4m v width,height)" 321,241
}

case_scaled_down() {
  make_video in.mp4 1920x1080 0.2
  dehaze --engine preview in.mp4 out.mp4
  says 'scaled down from 1920 x 1080 to 1280 x 720'
  equal "$(stream out.mp4 v width,height)" 1280,720
  make_video in.mp4 1080x1920 0.2
  dehaze --engine preview --force in.mp4 out.mp4
  equal "$(stream out.mp4 v width,height)" 406,720
}

case_too_small() {
  make_video in.mp4 126x240 0.2
  dehaze_fails 1 'at least 128 x 128' --engine preview in.mp4 out.mp4
  only_files in.mp4
}

case_size_changes_in_mid_stream() {
  local size
  for size in 320x240 480x200; do
    make_input -f lavfi -i "$(source_video $size 0.4)" -vf "$kHaze,format=yuv420p" -c:v libx264 \
      -preset ultrafast $size.h264
  done
  cat 320x240.h264 480x200.h264 >in.h264
  dehaze in.h264 out.mp4
  says 'change size .* brought to 320 x 240'
  equal "$(stream out.mp4 v width,height)" 320,240
  equal "$(frame_times out.mp4 | wc -l)" 20 frames
}

case_max_frames() {
  make_video in.mp4 320x240 2
  dehaze --max-frames 10 in.mp4 out.mp4
  equal "$(frame_times out.mp4)" "$(frame_times in.mp4 | first_lines 10)" "time stamps"
  # 10 frames are 0.4 seconds; the audio ends with them, to the packet of 1024 / 44100 seconds.
  ffprobe -v error -show_entries stream=duration -of csv=p=0 out.mp4 |
    awk '$1 < 0.39 || $1 > 0.45 { exit 1 }' || fail "$(stream out.mp4 v duration) seconds"
  ffprobe -v error -select_streams a -show_entries packet=data_hash,pts_time -show_data_hash md5 \
    -of csv=p=0 out.mp4 >got
  ffprobe -v error -select_streams a -show_entries packet=data_hash,pts_time -show_data_hash md5 \
    -of csv=p=0 in.mp4 | first_lines "$(wc -l <got)" >want
  cmp got want
}

# peak_kilobytes COMMAND...: the most memory that it had.
peak_kilobytes() {
  python3 - "$@" <<'PYTHON'
import resource, subprocess, sys
subprocess.run(sys.argv[1:], check=True)
print(resource.getrusage(resource.RUSAGE_CHILDREN).ru_maxrss)
PYTHON
}

case_memory_stays_flat() {
  command -v python3 >/dev/null || skip "python3 is not installed"
  [ -z "$SANITIZERS" ] || skip "sanitizers keep freed memory"
  make_video short.mp4 320x240 4
  make_input -stream_loop 14 -i short.mp4 -c copy in.mp4
  local few many
  few=$(peak_kilobytes "$DEHAZE" --quiet --max-frames 150 in.mp4 few.mkv)
  many=$(peak_kilobytes "$DEHAZE" --quiet in.mp4 many.mkv)
  equal "$(frame_times many.mkv | wc -l)" 1500 frames
  # Ten times the frames; one of them has 115 kilobytes.
  [ $((many - few)) -lt 8000 ] || fail "$few kilobytes for 150 frames, $many for 1500"
}

case_alternating_frames() {
  # Every second frame uses the estimate of the one before: a still scene gives two equal frames.
  make_picture in.png 320x240
  make_input -loop 1 -i in.png -frames:v 4 -vf format=yuv420p in.y4m
  dehaze in.y4m out.y4m
  equal "$(frame_digest out.y4m | cut -d, -f6 | sort -u | wc -l)" 1 "different frames"
}

case_audio_that_does_not_fit() {
  make_input -f lavfi -i "$(source_video 320x240 0.2)" -f lavfi -i sine=duration=0.2 -pix_fmt yuv420p \
    -c:v libx264 -c:a pcm_s16le in.mkv
  dehaze_fails 1 'cannot hold pcm_s16le audio; use .mkv' in.mkv out.mp4
  only_files in.mkv
  dehaze in.mkv out.mkv
  equal "$(audio_digest out.mkv)" "$(audio_digest in.mkv)" audio
}

case_no_video() {
  make_input -f lavfi -i sine=duration=0.2 in.wav
  dehaze_fails 1 'holds no picture or video' in.wav out.mp4
  make_picture cover.jpg 160x160 yuvj420p
  make_input -f lavfi -i sine=duration=0.2 -i cover.jpg -map 0 -map 1 -c:a aac -c:v copy \
    -disposition:v attached_pic in.m4a
  dehaze_fails 1 'only a cover picture' in.m4a out.mp4
  only_files in.wav cover.jpg in.m4a
}

case_other_codecs() {
  local kind
  for kind in avi:mpeg4 webm:libvpx gif:gif mpg:mpeg1video; do
    make_input -f lavfi -i "$(source_video 320x240 0.4)" -vf "$kHaze" -c:v "${kind#*:}" "in.${kind%:*}"
    dehaze --force "in.${kind%:*}" out.mp4
    equal "$(frame_times out.mp4 | wc -l)" 10 "frames from ${kind%:*}"
  done
}

run_case "$1"
