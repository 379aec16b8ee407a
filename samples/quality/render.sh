#!/bin/sh
# Renders the scenes with and without haze:  render.sh OUTPUT_FOLDER
#
# Writes SCENE_clear.png and SCENE_HAZE.png. What exists already is kept. Every pixel is the mean of
# the same 3 x 3 rays in all pictures of a scene, so that pairs are comparable along edges.
set -eu

out=${1:?usage: $0 OUTPUT_FOLDER}
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

# trace NAME SCENE HEIGHT OPTION...
trace() {
  name=$1 scene=$2 height=$3
  shift 3
  [ -e "$out/$name.png" ] && return
  echo "$name"
  if ! povray "+I$scene.pov" +L. +Opicture.png +W800 "+H$height" +Q9 +AM1 +A0.0 +R3 +FN8 -D -C -J \
    File_Gamma=srgb Dither=off "$@" >log 2>&1; then
    cat log >&2
    exit 1
  fi
  mv picture.png "$out/$name.png"
}

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
  trace "${scene}_clear" "$scene" 600
  for name in light dense warm dusk; do
    haze $name
    trace "${scene}_$name" "$scene" 600 Declare=Density=$density Declare=LightR=$red \
      Declare=LightG=$green Declare=LightB=$blue
  done
done

# The sample street, whose fog has a parameter of its own and a view of 16 : 9.
trace street_clear street 450 +K0.1 Declare=Fog=0
for name in light dense warm dusk; do
  haze $name
  distance=$(awk "BEGIN { print 100 / $density }")
  trace "street_$name" street 450 +K0.1 Declare=Fog=1 "Declare=FogDistance=$distance" \
    Declare=LightR=$red Declare=LightG=$green Declare=LightB=$blue
done
