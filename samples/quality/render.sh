#!/bin/sh
# Renders the scenes with and without haze:  render.sh OUTPUT_FOLDER [views]
#
# Writes SCENE_clear.png and SCENE_HAZE.png; with "views" further views as VIEW_clear.png, and through
# black and white haze of density 1 in 16 bits, from whose difference the transmission follows. What
# exists already is kept. Every pixel is the mean of the same 3 x 3 rays in all pictures of a scene,
# so that pairs are comparable along edges.
set -eu

out=${1:?usage: $0 OUTPUT_FOLDER [views]}
what=${2:-pairs}
command -v povray >/dev/null 2>&1 || { echo "$0: POV-Ray 3.7 is missing" >&2; exit 1; }
here=$(cd "$(dirname "$0")" && pwd)
mkdir -p "$out"
out=$(cd "$out" && pwd)

# POV-Ray's usual configuration allows reading and writing below the current folder only.
work=$(mktemp -d "$out/work.XXXXXX")
trap 'rm -rf "$work"' EXIT
trap 'exit 1' HUP INT TERM
cp "$here"/*.pov "$here"/*.inc "$here"/../scene/*.pov "$here"/../scene/*.inc "$work"
cd "$work"

# trace NAME SCENE WIDTH HEIGHT OPTION...
trace() {
  name=$1 scene=$2 width=$3 height=$4
  shift 4
  [ -e "$out/$name.png" ] && return
  echo "$name"
  if ! povray "+I$scene.pov" +L. +Opicture.png "+W$width" "+H$height" +Q9 +AM1 +A0.0 +R3 +FN8 -D -C -J \
    File_Gamma=srgb Dither=off "$@" >log 2>&1; then
    cat log >&2
    exit 1
  fi
  mv picture.png "$out/$name.png"
}

if [ "$what" = views ]; then
  # view NAME SCENE [CAMERA TARGET]: without a camera that of the scene.
  view() {
    view=$1 of=$2 rows=480 clear=Density=0 hazy=Density=1 sampling=
    [ "$of" != street ] || { rows=360 clear=Fog=0 hazy=Fog=1 sampling=+K0.1; }
    if [ $# -gt 2 ]; then
      sed "s|location <[^>]*>|location <$3>|; s|look_at <[^>]*>|look_at <$4>|
        s|^#declare CameraAt.*|#declare CameraAt = <$3>;|; s|^#declare CameraTo.*|#declare CameraTo = <$4>;|" \
        "$of.pov" >view.pov
    else
      cp "$of.pov" view.pov
    fi
    trace "${view}_clear" view 640 $rows $sampling Declare=$clear
    trace "${view}_black" view 640 $rows $sampling +FN16 Declare=$hazy Declare=LightR=0 Declare=LightG=0 \
      Declare=LightB=0
    trace "${view}_white" view 640 $rows $sampling +FN16 Declare=$hazy Declare=LightR=255 \
      Declare=LightG=255 Declare=LightB=255
  }
  while IFS=: read -r name camera target; do
    view "$name" "${name%?}" ${camera:+"$camera" "$target"}
  done <"$here/views.txt"
  exit
fi

# The haze of a name: density, light.
haze() {
  case $1 in
    light) density=0.5 red=205 green=208 blue=212 ;;
    dense) density=1.6 red=213 green=214 blue=214 ;;
    warm) density=1 red=226 green=196 blue=150 ;;
    dusk) density=1 red=140 green=158 blue=186 ;;
  esac
}

for scene in landscape harbour town forest beach; do
  trace "${scene}_clear" "$scene" 800 600
  for name in light dense warm dusk; do
    haze $name
    trace "${scene}_$name" "$scene" 800 600 Declare=Density=$density Declare=LightR=$red \
      Declare=LightG=$green Declare=LightB=$blue
  done
done

# The sample street, whose fog has a parameter of its own and a view of 16 : 9.
trace street_clear street 800 450 +K0.1 Declare=Fog=0
for name in light dense warm dusk; do
  haze $name
  distance=$(awk "BEGIN { print 100 / $density }")
  trace "street_$name" street 800 450 +K0.1 Declare=Fog=1 "Declare=FogDistance=$distance" \
    Declare=LightR=$red Declare=LightG=$green Declare=LightB=$blue
done
