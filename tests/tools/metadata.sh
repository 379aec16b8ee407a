#!/usr/bin/env bash
# What picture files hold beside the pixels: EXIF, orientation, colour profile.
source "$(dirname "$0")/lib.sh"

tag_of() { ffprobe -v error -show_entries "frame_tags=$2" -of csv=p=0 "$1"; }

# exif_webp IN OUT ORIENTATION: the same for a WebP file of 322 x 200 pixels without any such blocks.
exif_webp() {
  python3 - "$@" <<'PYTHON'
import struct, sys
frame = open(sys.argv[1], "rb").read()[12:]
def block(name, data): return name + struct.pack("<I", len(data)) + data
exif = b"MM\0\x2a" + struct.pack(">IHHHIHHI", 8, 1, 0x0112, 3, 1, int(sys.argv[3]), 0, 0)
size = (322 - 1).to_bytes(3, "little") + (200 - 1).to_bytes(3, "little")
blocks = b"WEBP" + block(b"VP8X", b"\x08\0\0\0" + size) + frame + block(b"EXIF", exif)
open(sys.argv[2], "wb").write(b"RIFF" + struct.pack("<I", len(blocks)) + blocks)
PYTHON
}

# EXIF orientations, each with the filter that makes a picture upright.
kTurns='1:null 2:hflip 3:hflip,vflip 4:vflip 5:transpose=0 6:transpose=clock 7:transpose=3
  8:transpose=cclock'

# At a level nothing is judged. Left to itself, the tool looks for the light where up is.
case_exif_orientation() {
  make_picture plain.jpg 321x200 yuvj420p
  dehaze --level 10 plain.jpg upright.png
  local turn
  for turn in $kTurns; do
    exif_jpeg plain.jpg in.jpg "${turn%%:*}"
    make_input -i upright.png -vf "${turn#*:}" want.png
    dehaze --force --level 10 in.jpg out.png
    same_picture out.png want.png
    dehaze --force --level 10 in.jpg out.jpg
    close_pictures out.jpg want.png 28
    equal "$(tag_of out.jpg Orientation | tr -d ' ')" 1 "orientation of the upright output"
  done
}

# WebP has nothing but the EXIF block to say it.
case_exif_orientation_of_webp() {
  command -v python3 >/dev/null || skip "python3 is not installed"
  make_picture plain.webp 322x200 yuv420p
  dehaze --level 10 plain.webp upright.png
  local turn
  for turn in $kTurns; do
    exif_webp plain.webp in.webp "${turn%%:*}"
    make_input -i upright.png -vf "${turn#*:}" want.png
    dehaze --force --level 10 in.webp out.png
    same_picture out.png want.png
  done
}

case_color_profile() {
  make_picture plain.jpg 160x160 yuvj420p
  profile_jpeg plain.jpg in.jpg
  local kind
  for kind in jpg png webp; do
    dehaze in.jpg "out.$kind"
    says_nothing
    has_profile "out.$kind"
  done
}

# make_exif FILE ORDER: a camera's EXIF for a picture of 640 x 480 with orientation 6 and a thumbnail;
# ORDER: II or MM.
make_exif() {
  python3 - "$1" "$2" <<'PYTHON'
import struct, sys
order = "<" if sys.argv[2] == "II" else ">"
def entry(tag, kind, count, value):
    if kind == 3 and count == 1:
        return struct.pack(order + "HHIHH", tag, kind, count, value, 0)
    return struct.pack(order + "HHII", tag, kind, count, value)
model = b"Hazy Camera\0"
first, camera, text, second = 8, 80, 120, 140
ifd0 = struct.pack(order + "H", 4) + entry(0x0100, 3, 1, 640) + entry(0x0110, 2, 12, text) + \
    entry(0x0112, 3, 1, 6) + entry(0x8769, 4, 1, camera) + struct.pack(order + "I", second)
sub = struct.pack(order + "H", 2) + entry(0xA002, 4, 1, 640) + entry(0xA003, 3, 1, 480) + bytes(4)
thumb = struct.pack(order + "H", 1) + entry(0x0103, 3, 1, 6) + bytes(4)
data = bytearray(200)
data[0:8] = sys.argv[2].encode() + struct.pack(order + "HI", 42, first)
for at, part in ((first, ifd0), (camera, sub), (text, model), (second, thumb)):
    data[at:at + len(part)] = part
open(sys.argv[1], "wb").write(data)
PYTHON
}

# embed_exif IN OUT EXIF: into a JPEG file.
embed_exif() {
  python3 - "$@" <<'PYTHON'
import struct, sys
jpeg, exif = open(sys.argv[1], "rb").read(), b"Exif\0\0" + open(sys.argv[3], "rb").read()
segment = b"\xff\xe1" + struct.pack(">H", len(exif) + 2) + exif
open(sys.argv[2], "wb").write(jpeg[:2] + segment + jpeg[2:])
PYTHON
}

# check_exif FILE WIDTH HEIGHT: what make_exif made, for an upright picture of that size; found and
# read without any code of the tool.
check_exif() {
  python3 - "$@" <<'PYTHON'
import struct, sys, zlib
data = open(sys.argv[1], "rb").read()
def blocks():
    if data[:2] == b"\xff\xd8":
        at = 2
        while data[at + 1] != 0xDA:
            size = struct.unpack(">H", data[at + 2:at + 4])[0]
            if data[at + 4:at + 10] == b"Exif\0\0": yield data[at + 10:at + 2 + size]
            at += 2 + size
    elif data[:4] == b"RIFF":
        assert struct.unpack("<I", data[4:8])[0] == len(data) - 8
        at = 12
        while at < len(data):
            size = struct.unpack("<I", data[at + 4:at + 8])[0]
            if data[at:at + 4] == b"EXIF": yield data[at + 8:at + 8 + size]
            if data[at:at + 4] == b"VP8X":
                assert data[at + 8] & 8
                wide = 1 + int.from_bytes(data[at + 12:at + 15], "little")
                high = 1 + int.from_bytes(data[at + 15:at + 18], "little")
                assert (wide, high) == (int(sys.argv[2]), int(sys.argv[3])), (wide, high)
            at += 8 + size + size % 2
    else:
        at = 8
        while at < len(data):
            size = struct.unpack(">I", data[at:at + 4])[0]
            body = data[at + 4:at + 8 + size]
            assert struct.unpack(">I", data[at + 8 + size:at + 12 + size])[0] == zlib.crc32(body)
            if body[:4] == b"eXIf": yield body[4:]
            at += 12 + size
found = list(blocks())
assert len(found) == 1, len(found)
tiff = found[0]
order = "<" if tiff[:2] == b"II" else ">"
def directory(at):
    count = struct.unpack(order + "H", tiff[at:at + 2])[0]
    tags = {}
    for i in range(count):
        e = tiff[at + 2 + 12 * i:at + 14 + 12 * i]
        tag, kind, n = struct.unpack(order + "HHI", e[:8])
        tags[tag] = struct.unpack(order + ("HH" if kind == 3 else "I"), e[8:12])[0]
    return tags, struct.unpack(order + "I", tiff[at + 2 + 12 * count:at + 6 + 12 * count])[0]
tags, following = directory(struct.unpack(order + "I", tiff[4:8])[0])
camera, _ = directory(tags[0x8769])
width, height = int(sys.argv[2]), int(sys.argv[3])
assert tags[0x0112] == 1, tags
assert following == 0, "a thumbnail"
assert tags[0x0100] == width and camera[0xA002] == width and camera[0xA003] == height, camera
assert tiff[tags[0x0110]:tags[0x0110] + 12] == b"Hazy Camera\0"
PYTHON
}

case_exif_is_kept() {
  command -v python3 >/dev/null || skip "python3 is not installed"
  make_picture plain.jpg 640x480 yuvj420p
  local order kind from
  for order in II MM; do
    make_exif exif $order
    embed_exif plain.jpg in.jpg exif
    for kind in jpg png webp; do
      dehaze --force in.jpg out.$kind
      says_nothing
      equal "$(stream out.$kind v width,height)" 480,640
      check_exif out.$kind 480 640
      equal "$(ffmpeg -v error -xerror -err_detect explode -i out.$kind -f null - 2>&1)" ""
    done
    # And on from each of them.
    for from in png webp; do
      for kind in jpg png webp; do
        dehaze --force out.$from next.$kind
        check_exif next.$kind 480 640
      done
    done
  done
}

case_exif_and_profile_and_alpha_in_webp() {
  command -v python3 >/dev/null || skip "python3 is not installed"
  make_picture opaque.png 320x240
  make_input -i opaque.png -vf "format=rgba,geq=r=r(X\,Y):g=g(X\,Y):b=b(X\,Y):a=mod(X\,256)" in.png
  dehaze in.png out.webp
  make_exif exif MM
  # The tool's own writer puts EXIF into the PNG.
  make_picture plain.jpg 320x240 yuvj420p
  embed_exif plain.jpg exif.jpg exif
  dehaze --force exif.jpg exif.png
  python3 - <<'PYTHON'
source, target = open("exif.png", "rb").read(), open("in.png", "rb").read()
at = source.index(b"eXIf") - 4
size = int.from_bytes(source[at:at + 4], "big") + 12
open("both.png", "wb").write(target[:33] + source[at:at + size] + target[33:])
PYTHON
  dehaze --force both.png both.webp
  check_exif both.webp 320 240
  local file
  for file in out both; do
    make_input -i $file.webp -vf "format=rgba,alphaextract,format=gray" $file.alpha.png
  done
  same_picture out.alpha.png both.alpha.png
}

case_damaged_exif() {
  command -v python3 >/dev/null || skip "python3 is not installed"
  make_picture plain.jpg 320x240 yuvj420p
  make_exif exif II
  local bytes
  for bytes in 1 7 9 30 60 85; do
    head -c $bytes exif >cut
    embed_exif plain.jpg in.jpg cut
    dehaze --force in.jpg out.png
    says 'camera data .* is damaged; it is left out'
  done
  # Offsets that lead nowhere.
  python3 -c '
d = bytearray(open("exif", "rb").read()); d[4:8] = b"\xff\xff\xff\xff"; open("wild", "wb").write(d)'
  embed_exif plain.jpg in.jpg wild
  dehaze --force in.jpg out.webp
  says 'is damaged'
}

case_exif_too_long_for_jpeg() {
  command -v python3 >/dev/null || skip "python3 is not installed"
  make_picture plain.jpg 320x240 yuvj420p
  make_exif exif II
  embed_exif plain.jpg in.jpg exif
  dehaze in.jpg in.png
  python3 - <<'PYTHON'
import struct, zlib
data = open("in.png", "rb").read()
at = data.index(b"eXIf") - 4
size = int.from_bytes(data[at:at + 4], "big")
body = data[at + 4:at + 8 + size] + bytes(70000)
chunk = struct.pack(">I", len(body) - 4) + body + struct.pack(">I", zlib.crc32(body))
open("long.png", "wb").write(data[:at] + chunk + data[at + 12 + size:])
PYTHON
  dehaze long.png out.jpg
  says 'too long for JPEG'
  dehaze long.png out.webp
  says_nothing
  check_exif out.webp 240 320
}

run_case "$1"
