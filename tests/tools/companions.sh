#!/usr/bin/env bash
# What goes with the pictures of a video: subtitles, chapters, fonts.
source "$(dirname "$0")/lib.sh"

make_subtitles() { # FILE
  cat >"$1" <<'TEXT'
1
00:00:00,200 --> 00:00:00,900
The fog is thick.

2
00:00:01,200 --> 00:00:01,700
It lifts – at <i>last</i>.
TEXT
}

make_chapters() { # FILE
  printf '%s\n' ';FFMETADATA1' '[CHAPTER]' TIMEBASE=1/1000 START=0 END=1000 'title=In the fog' \
    '[CHAPTER]' TIMEBASE=1/1000 START=1000 END=2000 'title=Out – of it' >"$1"
}

# make_film FILE [FFMPEG_OPTION...]: video, sound, two subtitle tracks and chapters.
make_film() {
  make_video plain.mkv 320x240 2
  make_subtitles text.srt
  make_chapters chapters
  make_input -i plain.mkv -i text.srt -i chapters -map 0 -map 1 -map 1 -map_metadata 0 -map_chapters 2 \
    -c copy -metadata:s:s:0 language=eng -metadata:s:s:1 language=deu "${@:2}" "$1"
}

text_of() { ffmpeg -nostdin -v error -i "$1" -map "0:s:${2:-0}" -f srt - | tr -d '\r'; }
chapters_of() {
  ffprobe -v error -show_chapters -of csv=p=0 "$1" | awk -F, '{ printf "%.2f %.2f %s\n", $4, $6, $7 }'
}
languages_of() {
  ffprobe -v error -select_streams s -show_entries stream_tags=language -of csv=p=0 "$1" | tr '\n' ' '
}

case_same_container() {
  local kind codec
  for pair in mkv:srt mp4:mov_text mov:mov_text mkv:ass; do
    kind=${pair%:*} codec=${pair#*:}
    make_film in.$kind -c:s $codec
    dehaze --force in.$kind out.$kind
    says_nothing
    equal "$(stream out.$kind s codec_name)" "$(stream in.$kind s codec_name)" codecs
    equal "$(text_of out.$kind 0)" "$(text_of in.$kind 0)" text
    equal "$(text_of out.$kind 1)" "$(text_of in.$kind 1)" "second text"
    equal "$(chapters_of out.$kind)" "$(chapters_of in.$kind)" chapters
    equal "$(chapters_of out.$kind | wc -l)" 2 "number of chapters"
    equal "$(languages_of out.$kind)" "$(languages_of in.$kind)" languages
    equal "$(audio_digest out.$kind)" "$(audio_digest in.$kind)" audio
  done
}

case_other_container() {
  make_film in.mkv
  dehaze in.mkv out.mp4
  says_nothing
  equal "$(stream out.mp4 s:0 codec_name)" mov_text
  equal "$(text_of out.mp4 1)" "$(text_of in.mkv 1)" text
  equal "$(chapters_of out.mp4)" "$(chapters_of in.mkv)" chapters
  equal "$(languages_of out.mp4)" "eng deu " languages
  dehaze out.mp4 back.mkv
  says_nothing
  equal "$(stream back.mkv s:0 codec_name)" subrip
  equal "$(text_of back.mkv)" "$(text_of in.mkv)" text
  equal "$(chapters_of back.mkv)" "$(chapters_of in.mkv)" chapters
}

case_pictures_as_subtitles() {
  make_video plain.mkv 320x240 2
  # A stream of Blu-ray subtitles that shows nothing: one composition without objects, and its end.
  printf 'PG\0\x01\x5f\x90\0\0\0\0\x16\0\x0b\x01\x40\0\xf0\x10\0\0\x80\0\0\0' >in.sup
  printf 'PG\0\x01\x5f\x90\0\0\0\0\x80\0\0' >>in.sup
  make_input -i plain.mkv -f sup -i in.sup -map 0 -map 1 -c copy in.mkv
  dehaze in.mkv out.mkv
  says_nothing
  equal "$(stream out.mkv s codec_name)" hdmv_pgs_subtitle
  dehaze in.mkv out.mp4
  says 'cannot hold hdmv_pgs_subtitle subtitles; they are left out'
  equal "$(stream out.mp4 s codec_name)" ""
}

case_cut_off() {
  make_film in.mkv
  local kind
  for kind in mkv mp4; do
    dehaze --max-frames 20 in.mkv out.$kind
    equal "$(chapters_of out.$kind)" "0.00 0.80 In the fog" chapters
    equal "$(text_of out.$kind | grep -c -- '-->')" 1 "subtitles in $kind"
    equal "$(frame_times out.$kind | wc -l)" 20 frames
  done
}

case_fonts() {
  make_film plain_film.mkv -c:s ass
  seq 1000 >font.ttf
  make_input -i plain_film.mkv -map 0 -c copy -attach font.ttf \
    -metadata:s:t mimetype=application/x-truetype-font in.mkv
  dehaze in.mkv out.mkv
  says_nothing
  ffmpeg -nostdin -v error -dump_attachment:t:0 got.ttf -i out.mkv -f null - || true
  cmp got.ttf font.ttf
}

case_start_is_moved() {
  # A transport stream starts at 1.4 seconds; what goes with it moves along.
  make_video in.ts 320x240 1
  make_chapters chapters
  make_subtitles text.srt
  make_input -i in.ts -itsoffset 1.4 -i text.srt -i chapters -copyts -map 0 -map 1 -map_chapters 2 -c copy late.mkv
  dehaze late.mkv out.mkv
  local start
  start=$(ffprobe -v error -select_streams a -show_entries packet=pts_time -of csv=p=0 out.mkv | first_lines 1)
  awk -v t="$start" 'BEGIN { exit !(t >= 0 && t < 0.2) }' || fail "sound starts at $start"
}

run_case "$1"
