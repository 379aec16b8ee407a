#!/usr/bin/env bash
# The table of inputs: whatever comes in ends in a result that can be decoded or in a message that
# names the file, in reasonable time, with nothing left behind. Each case prints its lines of the table;
# `tests/tools/inputs.sh table` (with DEHAZE set) prints all of it.
source "$(dirname "$0")/lib.sh"

# ends FILE OUTPUT VERDICT: "result", or what the message has to match.
ends() {
  local status=0
  rm -f "$2"
  timeout 40 "$DEHAZE" "$1" "$2" 2>messages </dev/null || status=$?
  printf '%-28s %-12s %s\n' "$1" "$2" "$(tail -n 1 messages | cut -c -150)"
  if [ "$3" = result ]; then
    [ $status -eq 0 ] || fail "$1: status $status: $(cat messages)"
    ffmpeg -nostdin -v error -xerror -i "$2" -f null - || fail "$1: the result cannot be decoded"
  else
    [ $status -eq 1 ] || fail "$1: status $status, not 1: $(cat messages)"
    grep -q "^dehaze: .*$1: " messages || fail "$1: not named in: $(cat messages)"
    says "$3"
    [ ! -e "$2" ] || fail "$1: an output in spite of an error"
  fi
  equal "$(find . -name '*.part*')" "" "unfinished files"
}

# still FILE [FFMPEG_OPTION...], film FILE [FFMPEG_OPTION...]
still() { make_input -f lavfi -i "$(source_video 160x160 0.04)" -frames:v 1 "${@:2}" "$1"; }
film() { make_input -f lavfi -i "$(source_video 160x160 0.4)" "${@:2}" "$1"; }

case_picture_formats() {
  local kind
  for kind in bmp dpx gif jp2 jls pcx ppm qoi sgi tif xwd; do
    still in.$kind
    ends in.$kind out.png result
  done
  still in.ljpg -c:v ljpeg -pix_fmt bgr24 -f image2
  ends in.ljpg out.jpg result
}

case_deep_and_odd_pictures() {
  still in16.png -pix_fmt rgba64be
  ends in16.png out.png result
  says '16-bit input is converted to 8 bits'
  still in.exr
  ends in.exr out.png result
  says 'floating-point input is cut off at 1'
  still in.pfm -pix_fmt gbrpf32le
  ends in.pfm out.jpg result
  still in12.jp2 -pix_fmt rgb48le
  ends in12.jp2 out.png result
  still in.pbm -pix_fmt monow
  ends in.pbm out.png result
  still in16.pgm -pix_fmt gray16be
  ends in16.pgm out.webp result
  still ya8.png -pix_fmt ya8
  ends ya8.png out.png result
  still ya16.png -pix_fmt ya16be
  ends ya16.png out.png result
  still pal8.png -pix_fmt pal8
  ends pal8.png out.png result
}

case_animated_pictures() {
  film in.gif
  ends in.gif out.png result
  says 'its first frame becomes the picture'
  ends in.gif out.mp4 result
  film anim.png -f apng
  ends anim.png out.png result
  ends anim.png out.mp4 result
  film in.webp -c:v libwebp_anim
  ends in.webp out.png 'animated WebP is not read'
}

# cmyk_jpeg FILE ADOBE_TRANSFORM: 160 x 160 pixels of four components, every 8 x 8 block of one colour.
cmyk_jpeg() {
  python3 - "$1" "$2" <<'PYTHON'
import struct, sys
size, blocks = 160, 20
# Lengths and symbols of the usual table for DC differences (ITU-T T.81, table K.3); of AC symbols
# only "end of block".
lengths, code, codes = [0, 1, 5, 1, 1, 1, 1, 1, 1] + [0] * 7, 0, []
for length, count in enumerate(lengths, 1):
    for _ in range(count):
        codes.append((code, length))
        code += 1
    code <<= 1
bits = ""
last = [0] * 4
for y in range(blocks):
    for x in range(blocks):
        for c, value in enumerate((x * 12, y * 12, 120, 200 - x * 4)):
            step = (value - 128) - last[c]  # the table divides by 8: one step is one level
            last[c] += step
            width = abs(step).bit_length()
            code, length = codes[width]
            bits += format(code, "0%db" % length)
            if width: bits += format(step if step > 0 else step + (1 << width) - 1, "0%db" % width)
            bits += "0"  # end of block
bits += "1" * (-len(bits) % 8)
scan = bytes(int(bits[i:i + 8], 2) for i in range(0, len(bits), 8)).replace(b"\xff", b"\xff\0")
def segment(marker, data): return b"\xff" + bytes([marker]) + struct.pack(">H", len(data) + 2) + data
open(sys.argv[1], "wb").write(
    b"\xff\xd8" + segment(0xEE, b"Adobe\0\x64\0\0\0\0" + bytes([int(sys.argv[2])])) +
    segment(0xDB, b"\0" + b"\x08" * 64) +
    segment(0xC0, struct.pack(">BHHB", 8, size, size, 4) + b"".join(bytes([i, 0x11, 0]) for i in (1, 2, 3, 4))) +
    segment(0xC4, b"\0" + bytes(lengths) + bytes(range(12))) +
    segment(0xC4, b"\x10" + bytes([1] + [0] * 15) + b"\0") +
    segment(0xDA, b"\x04\1\0\2\0\3\0\4\0\0\x3f\0") + scan + b"\xff\xd9")
PYTHON
}

case_cmyk_jpeg() {
  command -v python3 >/dev/null || skip "python3 is not installed"
  cmyk_jpeg cmyk.jpg 0
  cmyk_jpeg ycck.jpg 2
  local file
  for file in cmyk ycck; do
    ends $file.jpg out.png result
    equal "$(stream out.png v width,height,pix_fmt)" 160,160,rgb24
    # The colours are those that ffmpeg sees.
    make_input -i $file.jpg -vf format=rgb24 seen.png
    different_pictures seen.png out.png 60
    rm -f out.png
    dehaze --engine photo --strength 0 $file.jpg out.png
    close_pictures out.png seen.png 20
  done
}

# jpeg_440 FILE: 160 x 160 pixels, a chroma sample for two rows; every 8 x 8 block of one value.
jpeg_440() {
  python3 - "$1" <<'PYTHON'
import struct, sys
bits, last = "", [0] * 3
for y in range(10):
    for x in range(20):
        for c, value in ((0, 60 + x * 6), (0, 90 + x * 4), (1, 100 + y * 4), (2, 150 - x * 2)):
            step = (value - 128) - last[c]  # the table divides by 8: one step is one level
            last[c] += step
            width = abs(step).bit_length()
            # Twelve symbols of four bits each for DC differences, one of a bit, "end of block", for AC.
            bits += format(width, "04b")
            if width: bits += format(step if step > 0 else step + (1 << width) - 1, "0%db" % width)
            bits += "0"
bits += "1" * (-len(bits) % 8)
scan = bytes(int(bits[i:i + 8], 2) for i in range(0, len(bits), 8)).replace(b"\xff", b"\xff\0")
def segment(marker, data): return b"\xff" + bytes([marker]) + struct.pack(">H", len(data) + 2) + data
open(sys.argv[1], "wb").write(
    b"\xff\xd8" + segment(0xDB, b"\0" + b"\x08" * 64) +
    segment(0xC0, struct.pack(">BHHB", 8, 160, 160, 3) + bytes([1, 0x12, 0, 2, 0x11, 0, 3, 0x11, 0])) +
    segment(0xC4, b"\0" + bytes([0, 0, 0, 12] + [0] * 12) + bytes(range(12))) +
    segment(0xC4, b"\x10" + bytes([1] + [0] * 15) + b"\0") +
    segment(0xDA, b"\3\1\0\2\0\3\0\0\x3f\0") + scan + b"\xff\xd9")
PYTHON
}

case_jpeg_440() {
  command -v python3 >/dev/null || skip "python3 is not installed"
  jpeg_440 in.jpg
  equal "$(stream in.jpg v pix_fmt)" yuvj440p
  ends in.jpg out.png result
  make_input -i in.jpg -vf format=rgb24 seen.png
  different_pictures seen.png out.png 60
  rm out.png
  dehaze --engine photo --strength 0 in.jpg out.png
  close_pictures out.png seen.png 30
}

# Where chroma samples lie, colours lie.
case_chroma_sitings() {
  local siting seen=0
  for siting in left center topleft top bottomleft bottom; do
    film in.mkv -c:v libx264 -pix_fmt yuv420p -x264opts chromaloc=$seen
    seen=$((seen + 1))
    equal "$(stream in.mkv v chroma_location)" $siting
    ends in.mkv out.mkv result
    equal "$(stream out.mkv v chroma_location)" $siting
    ends in.mkv out.png result
    make_input -i in.mkv -frames:v 1 \
      -vf "zscale=min=170m:rin=limited:cin=$siting:m=gbr:r=full:f=lanczos,format=gbrp,format=rgb24" seen.png
    rm -f out.png
    dehaze --engine photo --strength 0 in.mkv out.png
    close_pictures out.png seen.png 30
  done
}

case_not_media() {
  : >empty.png
  ends empty.png out.png 'the file is empty'
  : >empty.mp4
  ends empty.mp4 out.mp4 'the file is empty'
  head -c 3000 /dev/urandom >noise.jpg
  ends noise.jpg out.png 'noise.jpg: '
  seq 2000 >text.mp4
  ends text.mp4 out.mp4 'not a picture or video that can be read'
  make_input -f lavfi -i sine=duration=0.2 sound.wav
  ends sound.wav out.mp4 'holds no picture or video'
  still photo.nef -c:v tiff -f image2
  ends photo.nef out.png 'camera raw files are not read'
  printf '\0\0\0\x18ftypheic\0\0\0\0heicmif1' >phone.heic
  ends phone.heic out.jpg 'HEIC and AVIF pictures are not read'
  film unknown.avi -c:v mpeg4
  LC_ALL=C sed -i 's/FMP4/ABCD/g' unknown.avi
  ends unknown.avi out.mp4 'there is no decoder for "ABCD"'
  ends missing.mp4 out.mp4 'No such file or directory'
}

case_no_frames() {
  local kind
  for kind in mp4 mkv avi; do
    film zero.$kind -c:v libx264 -frames:v 0
    ends zero.$kind out.mp4 'zero.*: '
  done
  head -n 1 <(film - -pix_fmt yuv420p -f yuv4mpegpipe -frames:v 1 2>/dev/null || true) >zero.y4m
  make_input -f lavfi -i "$(source_video 160x160 0.04)" -pix_fmt yuv420p -f yuv4mpegpipe one.y4m
  head -n 1 one.y4m | head -c 60 | tr -d '\0' >zero.y4m
  echo >>zero.y4m
  ends zero.y4m out.mp4 'zero.y4m: '
  film one.mp4 -c:v libx264 -frames:v 1
  ends one.mp4 out.mp4 result
  ends one.mp4 out.png result
}

case_cut_short() {
  film whole.mp4 -c:v libx264 -movflags +faststart
  film whole.mkv -c:v libx264
  still whole.png
  still whole.jpg -pix_fmt yuvj420p
  still whole.webp
  still whole.tif
  local kind
  for kind in mp4 mkv png jpg webp tif; do
    head -c $(($(stat -c %s whole.$kind) * 7 / 10)) whole.$kind >cut.$kind
    ends cut.$kind out.png "cut.$kind: |its first frame" || true
  done
}

case_missing_time_stamps() {
  film in.h264 -c:v libx264 -bf 2
  ends in.h264 out.mp4 result
  equal "$(frame_times out.mp4 | wc -l)" 10 frames
  # AVI has none of its own; the order of B-frames is all there is.
  make_input -i in.h264 -c copy in.avi
  ends in.avi out.mkv result
  equal "$(frame_times out.mkv | sort -u | wc -l)" 10 "time stamps"
  film in.m4v -c:v mpeg4 -f m4v
  ends in.m4v out.mp4 result
  film in.mjpeg -c:v mjpeg -pix_fmt yuvj420p
  # JPEG pictures one after the other are a picture with something behind it.
  ends in.mjpeg out.mp4 'a picture cannot become a video'
  film in.dv -vf scale=720:576 -r 25 -pix_fmt yuv420p
  ends in.dv out.mp4 result
}

case_time_stamps_that_go_back() {
  film one.ts -c:v libx264
  cat one.ts one.ts >twice.ts
  ends twice.ts out.mp4 'damaged or incomplete'
  # Where packets are whole, they are put in order.
  film one.mpg -c:v mpeg2video
  cat one.mpg one.mpg >twice.mpg
  ends twice.mpg out.mp4 result
  equal "$(frame_times out.mp4 | sort -u | wc -l)" 20 "time stamps"
}

case_changing_streams() {
  local format
  film a.h264 -c:v libx264 -pix_fmt yuv420p
  make_input -f lavfi -i "$(source_video 320x192 0.4)" -c:v libx264 -pix_fmt yuv420p b.h264
  film c.h264 -c:v libx264 -pix_fmt yuv422p10le
  cat a.h264 b.h264 c.h264 a.h264 >mixed.h264
  ends mixed.h264 out.mp4 result
  says 'change size or colour format in mid-stream'
  equal "$(stream out.mp4 v width,height,pix_fmt)" 160,160,yuv420p
  equal "$(frame_times out.mp4 | wc -l)" 40 frames
}

case_deep_and_odd_videos() {
  film ten.mp4 -c:v libx264 -pix_fmt yuv420p10le
  ends ten.mp4 out.mp4 result
  says '10-bit input is converted to 8 bits'
  film hdr.mkv -c:v libx264 -pix_fmt yuv420p10le -color_trc smpte2084 -color_primaries bt2020 \
    -colorspace bt2020nc
  ends hdr.mkv out.mkv result
  grep -q 'HDR values stay as they are' messages || fail "no note about HDR: $(cat messages)"
  film alpha.mkv -c:v ffv1 -pix_fmt yuva420p
  ends alpha.mkv out.mp4 result
  film grey.mkv -c:v ffv1 -pix_fmt gray
  ends grey.mkv out.mp4 result
  film grey10.mkv -c:v ffv1 -pix_fmt gray10le
  ends grey10.mkv out.mp4 result
  film palette.avi -c:v rawvideo -pix_fmt pal8
  ends palette.avi out.mp4 result
  film packed.avi -c:v rawvideo -pix_fmt yuyv422
  ends packed.avi out.mp4 result
  film prores.mov -c:v prores_ks -pix_fmt yuva444p10le
  ends prores.mov out.mov result
  film field.mkv -c:v libx264 -flags +ildct -x264opts tff=1 -vf "tinterlace=merge"
  ends field.mkv out.mkv result
}

# All that ffmpeg can convert to, as uncompressed video, except for those that differ from another
# one in byte order alone; the part $1 of 4.
check_pixel_formats() {
  local format number=0
  still color.png
  for format in $(ffmpeg -v error -pix_fmts | sed -nE 's/^IO[.H][.P][.B] ([a-z0-9]+) .*/\1/p'); do
    [[ $format != *[0-9]be ]] || continue
    number=$((number + 1))
    [ $((number % 4)) -eq "$1" ] || continue
    # The first frame through ffmpeg alone. Some formats do not survive in the container: ffmpeg
    # itself reads noise, or nothing.
    film $format.nut -frames:v 2 -c:v rawvideo -pix_fmt $format 2>/dev/null || continue
    make_input -i $format.nut -frames:v 1 -vf format=rgb24 seen.png 2>/dev/null || continue
    dehaze --force --engine photo --strength 0 $format.nut out.png
    printf '%-28s %s\n' $format "$(tail -n 1 messages)"
    [ "$(closeness seen.png color.png)" -lt 20 ] || close_pictures out.png seen.png 20
    rm $format.nut
  done
  [ $number -gt 80 ] || fail "only $number pixel formats"
}

case_pixel_formats_1() { check_pixel_formats 0; }
case_pixel_formats_2() { check_pixel_formats 1; }
case_pixel_formats_3() { check_pixel_formats 2; }
case_pixel_formats_4() { check_pixel_formats 3; }

if [ "$1" = table ]; then
  table=$(readlink -f "$0")
  for name in $(sed -nE 's/^case_([a-z0-9_]+)\(.*/\1/p' "$table"); do
    echo "-- $name"
    bash "$table" "$name" || echo "   FAILED"
  done
  exit
fi
run_case "$1"
