#!/usr/bin/env bash
# Shared by the topic scripts, which source it first and call run_case last. A case runs in an empty
# folder of its own; any command that fails unexpectedly fails the case.
set -euo pipefail

fail() {
  echo "FAILED: $*" >&2
  exit 1
}

skip() {
  echo "skipped: $*"
  exit 77
}

make_input() { ffmpeg -nostdin -v error -y "$@"; }

# A colourful still and moving picture of low contrast, as haze makes it.
kHaze="eq=contrast=0.6:brightness=0.15"
source_video() { echo "testsrc2=size=$1:rate=${3:-25}:duration=$2"; }
make_picture() { # FILE SIZE [PIXEL_FORMAT]
  make_input -f lavfi -i "$(source_video 640x480 0.04)" -frames:v 1 \
    -vf "$kHaze,scale=${2/x/:},format=${3:-rgb24}" "$1"
}
# Video with one sine tone of audio.
make_video() { # FILE SIZE SECONDS [FFMPEG_OPTION...]
  make_input -f lavfi -i "$(source_video "$2" "$3")" -f lavfi -i "sine=duration=$3" \
    -vf "$kHaze,format=yuv420p" -c:v libx264 -preset ultrafast -c:a aac -shortest "${@:4}" "$1"
}

# exif_jpeg IN OUT ORIENTATION: puts an EXIF segment with nothing but the orientation after the
# start of the JPEG file.
exif_jpeg() {
  {
    head -c 2 "$1"
    printf '\xff\xe1\x00\x22Exif\0\0MM\0\x2a\0\0\0\x08\0\x01\x01\x12\0\x03\0\0\0\x01\0'
    printf "\\x0$3\\0\\0\\0\\0\\0\\0"
    tail -c +3 "$1"
  } >"$2"
}

# profile_jpeg IN OUT: puts in a segment that is an ICC profile by its label; its content is carried,
# not read.
profile_jpeg() {
  {
    head -c 2 "$1"
    printf '\xff\xe2\x00\x90ICC_PROFILE\0\x01\x01'
    head -c 128 /dev/zero | tr '\0' 'p'
    tail -c +3 "$1"
  } >"$2"
}
has_profile() {
  ffprobe -v error -show_frames "$1" | holds 'ICC profile' || fail "no colour profile in $1"
}

dehaze() { "$DEHAZE" "$@" 2>messages || fail "dehaze $* ended with $?: $(cat messages)"; }

# dehaze_fails STATUS PATTERN ARGUMENT...: it must end with that status and a message like that.
dehaze_fails() {
  local status=0
  "$DEHAZE" "${@:3}" >stdout 2>messages || status=$?
  [ "$status" -eq "$1" ] || fail "dehaze ${*:3}: status $status, not $1: $(cat messages)"
  grep -q '^dehaze: ' messages || fail "dehaze ${*:3}: no message of its own: $(cat messages)"
  grep -Eq -- "$2" messages || fail "dehaze ${*:3}: expected /$2/ in: $(cat messages)"
  [ ! -s stdout ] || fail "dehaze ${*:3}: wrote to standard output"
}

says() { grep -Eq -- "$1" messages || fail "expected the message /$1/, not: $(cat messages)"; }
says_nothing() { [ ! -s messages ] || fail "expected no message, not: $(cat messages)"; }

# In pipes: these read to the end, so that the program before them is not stopped by SIGPIPE.
first_lines() { sed -n "1,$1p"; }
holds() { [ "$(grep -Ec -- "$1")" -gt 0 ]; }

# stream FILE v:0 width,height -> "640,480"
# (ffprobe closes the line with a comma if the stream has side data.)
stream() {
  ffprobe -v error -select_streams "$2" -show_entries "stream=$3" -of csv=p=0 "$1" |
    sed -E '/^$/d; s/,+$//'
}
equal() { [ "$1" = "$2" ] || fail "${3:-values}: expected \"$2\", got \"$1\""; }

frame_times() {
  ffprobe -v error -select_streams v -show_entries packet=pts_time -of csv=p=0 "$1" | sort -n
}
audio_digest() { ffmpeg -nostdin -v error -i "$1" -map "0:a:${2:-0}" -c copy -f md5 -; }
# All decoded samples, without any conversion.
frame_digest() {
  ffmpeg -nostdin -v error -i "$1" -map 0:v -vsync passthrough -f framemd5 - | grep -v '^#'
}

# closeness A B -> PSNR in whole decibels, 999 if equal
closeness() {
  local psnr
  psnr=$("$HAZE_COMPARE" "$1" "$2" | sed -E 's/^psnr ([^ ]+) dB.*/\1/')
  [ "$psnr" = inf ] && echo 999 || echo "${psnr%.*}"
}
same_picture() { equal "$(closeness "$1" "$2")" 999 "PSNR of $1 and $2"; }
close_pictures() { # A B LEAST_PSNR
  local psnr
  psnr=$(closeness "$1" "$2")
  [ "$psnr" -ge "$3" ] || fail "$1 and $2 differ: PSNR $psnr dB, expected at least $3"
}
different_pictures() { # A B MOST_PSNR
  local psnr
  psnr=$(closeness "$1" "$2")
  [ "$psnr" -le "$3" ] || fail "$1 and $2 are too close: PSNR $psnr dB, expected at most $3"
}

# No file but those named, hidden ones included.
only_files() {
  local found wanted
  found=$(find . -mindepth 1 -maxdepth 1 ! -name messages ! -name stdout -printf '%f\n' | sort)
  wanted=$(printf '%s\n' "$@" | sort)
  equal "$found" "$wanted" "files left"
}

run_case() {
  folder=$(mktemp -d)
  trap 'rm -rf "$folder"' EXIT
  cd "$folder"
  "case_$1"
}
