#!/bin/sh
# Renders the sample stills and the sample clip:  render.sh OUTPUT_FOLDER [stills|clip|all]
#
# Deterministic: antialiasing without jitter, no radiosity or photons. Each renderer process and each
# encoder uses one thread, because with more a pixel can differ by a few code values from run to
# run; all cores are kept busy by several renderers, each with pictures of its own.
set -eu

usage="usage: $0 OUTPUT_FOLDER [stills|clip|all]"
out=${1:?$usage}
what=${2:-all}
case $what in stills|clip|all) ;; *) echo "$usage" >&2; exit 2 ;; esac

for tool in povray ffmpeg; do
  if ! command -v "$tool" >/dev/null 2>&1; then
    echo "$0: $tool is missing; rendering needs POV-Ray 3.7 and FFmpeg with libx264" >&2
    exit 1
  fi
done

here=$(cd "$(dirname "$0")" && pwd)
mkdir -p "$out"
out=$(cd "$out" && pwd)

# POV-Ray's usual configuration allows reading and writing below the current folder only, so the
# scene is copied next to the pictures and everything is named relative to that place.
work=$(mktemp -d "$out/work.XXXXXX")
renderers=
trap 'kill $renderers 2>/dev/null || true; rm -rf "$work"' EXIT
trap 'exit 1' HUP INT TERM
cp "$here"/scene/*.pov "$here"/scene/*.inc "$work"
cd "$work"

frames=100
rate=25
still_clock=0.1

# trace JOB PICTURE OPTIONS...: starts a renderer for one picture or for frames of an animation.
# Everything that a user's own settings could change is said here.
trace() {
  job=$1
  picture=$2
  shift 2
  povray +Istreet.pov +L. "+O$picture" +W1280 +H720 +Q9 +WT1 -D -C -J File_Gamma=srgb Dither=off \
    "$@" >"$job.log" 2>&1 &
  renderers="$renderers $!"
}

await_renderers() {
  for renderer in $renderers; do
    if ! wait "$renderer"; then
      cat ./*.log >&2
      exit 1
    fi
  done
  renderers=
}

exact=accurate_rnd+full_chroma_int

# encode FILE FFMPEG-OPTIONS...
encode() {
  file=$1
  shift
  ffmpeg -v error -y "$@" -threads 1 -fflags +bitexact -flags:v +bitexact "$file"
}

# Every pixel of a still is the mean of the same 3 x 3 rays in all three pictures, whatever the
# contrast: a threshold of 0 keeps the pair comparable along edges.
still() {
  name=$1
  shift
  trace "$name" "$name.png" "+K$still_clock" +AM1 +A0.0 +R3 "$@"
}

if [ "$what" != clip ]; then
  echo "stills: clear, hazy, 1 - t"
  still street_clear +FN8 Declare=Fog=0
  still street_hazy +FN8 Declare=Fog=1
  still street_haze_share +FN16 Declare=Fog=2 Declare=Lights=0
  await_renderers
  for name in street_clear street_hazy street_haze_share; do
    # The renderer writes the date into its files; the copy has the same pixels and no date.
    encode "$out/$name.png" -i "$name.png" -pred mixed -update 1
  done
  for name in street_clear street_hazy; do
    encode "$out/$name.jpg" -i "$name.png" \
      -vf "scale=flags=$exact,format=yuvj444p" -q:v 2 -update 1
  done
fi

if [ "$what" != stills ]; then
  echo "clip: $frames frames"
  workers=$(getconf _NPROCESSORS_ONLN)
  if [ "$workers" -gt "$frames" ]; then workers=$frames; fi
  k=0
  while [ "$k" -lt "$workers" ]; do
    trace "frames$k" frame.png +FN8 +AM2 +A0.3 +R2 Declare=Fog=1 \
      +KFI1 "+KFF$frames" +KI0.0 +KF1.0 \
      "+SF$((k * frames / workers + 1))" "+EF$(((k + 1) * frames / workers))"
    k=$((k + 1))
  done
  await_renderers
  encode "$out/street_hazy.mp4" -framerate "$rate" -i frame%03d.png \
    -vf "scale=flags=$exact:out_color_matrix=bt709:out_range=tv,format=yuv420p" \
    -c:v libx264 -preset slow -crf 25 \
    -color_range tv -colorspace bt709 -color_primaries bt709 -color_trc bt709 \
    -movflags +faststart
fi
