#!/usr/bin/env bash
# The page that dehaze report writes, as text; report_browser.sh looks at it in a browser.
source "$(dirname "$0")/lib.sh"

report() { dehaze report "$@"; }

# What has to be there in any page, and what must not.
check_page() { # FILE MOST_BYTES
  [ "$(head -c 15 "$1")" = '<!DOCTYPE html>' ] || fail "$1 is no HTML page"
  [ "$(tail -n 1 "$1")" = '</html>' ] || fail "$1 has no end"
  [ "$(stat -c %s "$1")" -le "$2" ] || fail "$1 has $(stat -c %s "$1") bytes, more than $2"
  grep -q "default-src 'none'" "$1" || fail "$1 does not forbid to load anything"
  # Attributes and style that load something: data URIs alone.
  grep -oE '(src|href|data|action|poster|srcset)="[^"]{0,16}' "$1" | sort -u >loading
  equal "$(grep -cv '^src="data:image/' loading || true)" 0 "foreign references in $(cat loading)"
  ! grep -qE '@import|url\(|https?://|<link|<iframe|<object' "$1" || fail "$1 refers to something"
  check_balanced "$1"
}

# Every element that is opened is closed, in order.
check_balanced() {
  sed -E 's/base64,[^"]*//g' "$1" | python3 -c '
import html.parser, sys
class Checker(html.parser.HTMLParser):
    empty = {"meta", "img", "input", "path"}
    names = []
    def handle_starttag(self, name, attributes):
        if name not in self.empty: self.names.append(name)
        if len({k for k, _ in attributes}) != len(attributes): sys.exit(f"double attribute: {name}")
    def handle_startendtag(self, name, attributes): pass
    def handle_endtag(self, name):
        if not self.names or self.names.pop() != name: sys.exit(f"</{name}> without its begin")
checker = Checker()
checker.feed(sys.stdin.read())
if checker.names: sys.exit(f"open at the end: {checker.names}")
' >balance 2>&1 || fail "$1: $(cat balance)"
}

count() { grep -oE -- "$1" "$2" | wc -l; }

# picture_of FILE N: the N-th picture of the page as picture_N.jpg.
picture_of() {
  grep -oE 'data:image/jpeg;base64,[A-Za-z0-9+/=]+' "$1" | sed -n "${2}s/.*,//p" | base64 -d \
    >"picture_$2.jpg"
}

case_picture() {
  make_picture in.png 640x480
  report in.png -o out.html
  says_nothing
  check_page out.html 1000000
  equal "$(count '<h2>[^<]*' out.html)" 3
  equal "$(count 'class="compare"' out.html)" 1
  equal "$(count '<input type="range"' out.html)" 1
  equal "$(count '<svg ' out.html)" 2 "histograms"
  equal "$(count 'data:image/jpeg;base64,' out.html)" 3 "pictures: after, before, map"
  grep -q "dehaze $VERSION" out.html || fail "no version"
  only_files in.png out.html loading balance
}

# What is shown is what dehaze makes of the input, and the input itself.
case_shows_the_result() {
  make_picture in.png 640x480
  report --level 60 in.png -o out.html
  dehaze --level 60 in.png after.png
  dehaze --level 60 --show map in.png map.png
  picture_of out.html 1
  picture_of out.html 2
  picture_of out.html 3
  close_pictures after.png picture_1.jpg 30
  close_pictures in.png picture_2.jpg 28
  close_pictures map.png picture_3.jpg 30
  different_pictures picture_1.jpg picture_2.jpg 26
}

case_video() {
  make_video in.mp4 320x240 2
  report --engine preview in.mp4 -o out.html
  check_page out.html 1000000
  # 50 frames: 0, 16, 32 and 48 are kept.
  equal "$(count '<figure class="compare"' out.html)" 4
  equal "$(count '<input type="radio"' out.html)" 4
  equal "$(grep -oE '<span>[0-9.]+ s</span></label>' out.html | tr -d '\n' | sed 's/<[^>]*>/ /g' |
    xargs)" "0.0 s 0.6 s 1.3 s 1.9 s"
  equal "$(count '<figure class="lines">' out.html)" 3
  grep -q '<th scope="row">Estimate</th><td>25</td>' out.html || fail "no time of estimates"
  grep -q '<th scope="row">Reuse</th><td>25</td>' out.html || fail "no time of reuses"
  report --engine preview --max-frames 3 in.mp4 -o short.html
  equal "$(count '<figure class="compare"' short.html)" 3
  report --max-frames 1 in.mp4 -o single.html
  check_page single.html 1000000
  equal "$(count '<input type="radio"' single.html)" 0
}

case_standard_input() {
  make_video in.mp4 160x160 0.4
  make_input -i in.mp4 -pix_fmt yuv420p in.y4m
  report - -o out.html <in.y4m
  check_page out.html 1000000
  grep -q '<h1>standard input</h1>' out.html || fail "no heading"
  # Of 10 frames, which nobody announced: 0, 2, 4, 6 and 8.
  equal "$(count '<figure class="compare"' out.html)" 5
  make_input -i in.mp4 -pix_fmt yuv420p -f rawvideo in.raw
  report --raw 160x160 in.raw -o raw.html
  check_page raw.html 1000000
}

# The figures are those of haze_compare.
case_reference() {
  make_picture hazy.png 320x240
  make_input -i hazy.png -vf eq=contrast=1.4:brightness=-0.1,format=rgb24 clear.png
  report --strength 60 hazy.png --reference clear.png -o out.html
  check_page out.html 1000000
  dehaze --strength 60 hazy.png dehazed.png
  local psnr ssim ciede2000 hue
  read -r psnr ssim ciede2000 hue <<<"$("$HAZE_COMPARE" --all clear.png dehazed.png |
    awk '{print $2, $5, $7, $9}')"
  sed -nE 's/.*row">(PSNR|SSIM|CIEDE|Hue)[^<]*<.th>//p' out.html |
    sed -E 's/<[^>]*>/ /g' | awk '{print $2}' | xargs >figures
  awk -v want="$psnr $ssim $ciede2000 $hue" '{
    split(want, w)
    for (i = 1; i <= 4; ++i) if ($i - w[i] > 0.0051 || w[i] - $i > 0.0051) exit 1
    if ($1 != w[1] || $2 != w[2]) exit 1
  }' figures || fail "haze_compare says $psnr $ssim $ciede2000 $hue, the page $(cat figures)"
  grep -q 'Against clear.png' out.html || fail "no name of the reference"
}

case_reference_video() {
  make_video hazy.mp4 160x160 0.4
  make_input -i hazy.mp4 -vf eq=contrast=1.4 -c:v libx264 -preset ultrafast clear.mp4
  report hazy.mp4 --reference clear.mp4 -o out.html
  check_page out.html 1000000
  grep -q 'mean of the 5 frames' out.html || fail "$(grep Against out.html)"
  # A video is no worse than itself.
  report hazy.mp4 --reference hazy.mp4 -o same.html
  grep -q '<th scope="row">PSNR, dB</th><td>∞</td>' same.html || fail "$(grep 'PSNR, dB' same.html)"
  grep -q '<th scope="row">SSIM</th><td>1.0000</td>' same.html || fail "$(grep 'SSIM' same.html)"
}

case_wrong_reference() {
  make_picture in.png 320x240
  make_picture small.png 160x120
  make_video in.mp4 320x240 0.4
  make_video short.mp4 320x240 0.2
  dehaze_fails 1 'reference is 160 x 120, but the input is 320 x 240' \
    report in.png --reference small.png -o out.html
  dehaze_fails 1 'in.mp4: is a video, but the input is a picture' \
    report in.png --reference in.mp4 -o out.html
  dehaze_fails 1 'short.mp4: has fewer frames' report in.mp4 --reference short.mp4 -o out.html
  dehaze_fails 1 'none.png' report in.png --reference none.png -o out.html
  only_files in.png small.png in.mp4 short.mp4
}

# Names come from anywhere.
case_escaping() {
  local name='<img src=x onerror="alert(1)">&amp;'"'"'<title>.png'
  make_picture in.png 160x160
  cp in.png "$name"
  report "$name" --reference "$name" -o out.html
  check_page out.html 1000000
  ! grep -q '<img src=x' out.html || fail "a name became a part of the page"
  local safe='&lt;img src=x onerror=&quot;alert(1)&quot;&gt;&amp;amp;&#39;&lt;title&gt;.png'
  grep -qF "<h1>$safe</h1>" out.html || fail "$(grep '<h1>' out.html)"
  grep -qF "<title>$safe - haze report</title>" out.html || fail "$(grep '<title>' out.html)"
  mkdir folder
  mv in.png folder/in.png
  report folder/in.png -o plain.html
  ! grep -q 'folder' plain.html || fail "the page tells where the file was"
}

# The page stays small, whatever is on the pictures.
case_size() {
  make_input -f lavfi -i "testsrc2=size=2400x1600,noise=alls=100" -frames:v 1 noise.png
  report --force noise.png -o out.html
  check_page out.html 3000000
  make_input -f lavfi -i "testsrc2=size=480x270:duration=0.24,noise=alls=100:allf=t" \
    -c:v libx264 -preset ultrafast noise.mp4
  report noise.mp4 --reference noise.mp4 -o video.html
  equal "$(count '<figure class="compare"' video.html)" 6
  check_page video.html 3000000
}

case_orientation_and_odd_size() {
  make_video flat.mp4 320x200 0.2
  make_input -i flat.mp4 -c copy -metadata:s:v rotate=90 in.mp4
  report in.mp4 -o out.html
  picture_of out.html 1
  equal "$(stream picture_1.jpg v width,height)" 200,320
  make_input -i in.mp4 -frames:v 1 turned.png
  picture_of out.html 2
  close_pictures turned.png picture_2.jpg 22
  make_picture odd.jpg 321x201 yuvj420p
  report odd.jpg --force -o out.html
  check_page out.html 1000000
  picture_of out.html 1
  equal "$(stream picture_1.jpg v width,height)" 321,201
}

case_camera_picture() {
  make_picture plain.jpg 320x200 yuvj420p
  exif_jpeg plain.jpg turned.jpg 6
  profile_jpeg turned.jpg in.jpg
  make_input -i plain.jpg -vf transpose=clock want.png
  report in.jpg --reference want.png -o out.html
  picture_of out.html 1
  picture_of out.html 2
  equal "$(stream picture_1.jpg v width,height)" 200,320
  close_pictures want.png picture_2.jpg 28
  # The colours mean the same in the page.
  has_profile picture_1.jpg
  has_profile picture_2.jpg
}

case_long_pixels() {
  make_input -f lavfi -i "testsrc2=size=320x240:duration=0.2" -vf setsar=2/1,format=yuv420p \
    -c:v libx264 -preset ultrafast in.mp4
  report in.mp4 -o out.html
  picture_of out.html 1
  equal "$(stream picture_1.jpg v width,height)" 640,240
}

case_scaled_down() {
  make_video in.mp4 1600x900 0.2
  report --engine preview in.mp4 -o out.html
  says 'scaled down from 1600 x 900'
  grep -q '<h2>Notes' out.html || fail "no notes"
  grep -q 'Scaled down to</dt><dd>1280 x 720' out.html || fail "no size"
  report --quiet --force --engine preview --max-frames 1 --reference in.mp4 in.mp4 -o out.html
  says_nothing
  grep -q '<h2>Closeness' out.html || fail "no comparison at the reduced size"
}

case_usage() {
  make_picture in.png 160x160
  dehaze_fails 2 'INPUT is required' report
  dehaze_fails 2 '-o PAGE.html is required' report in.png
  dehaze_fails 2 'out.png: a report is a page' report in.png -o out.png
  dehaze_fails 2 'a report is a page' report in.png -o -
  dehaze_fails 2 'about one picture or video' report in.png in.png in.png
  dehaze_fails 2 'name of the input is empty' report '' -o out.html
  dehaze_fails 2 'name of the reference is empty' report in.png -o out.html --reference ''
  dehaze_fails 2 'not expected' report --bogus in.png -o out.html
  dehaze_fails 2 'not expected' report --show map in.png -o out.html
  dehaze_fails 2 'not in range' report --level 300 in.png -o out.html
  dehaze_fails 1 'No such file' report none.png -o out.html
  dehaze_fails 1 'is a folder' report . -o out.html
  dehaze_fails 1 'no such folder' report in.png -o none/out.html
  mkdir folder.html
  dehaze_fails 1 'folder.html: is a folder; give the name of a file' report in.png -o folder.html
  rmdir folder.html
  only_files in.png
  report in.png out.html
  cp out.html before.html
  dehaze_fails 1 'exists already' report in.png -o out.html
  cmp out.html before.html
  report --force --strength 90 in.png -o out.html
  ! cmp -s out.html before.html || fail "the page was not overwritten"
  "$DEHAZE" report --help | grep -q -- '--reference' || fail "no options in the help"
}

case_damaged_input() {
  make_picture in.jpg 320x240 yuvj420p
  head -c 300 in.jpg >cut.jpg
  dehaze_fails 1 'cut.jpg' report cut.jpg -o out.html
  make_video in.mkv 160x160 1
  head -c 20000 in.mkv >cut.mkv
  dehaze_fails 1 'cut.mkv' report cut.mkv -o out.html
  only_files in.jpg cut.jpg in.mkv cut.mkv
}

# "report" is a word of the command line only in the first place.
case_files_of_that_name() {
  make_picture report.png 160x160
  mv report.png report
  dehaze ./report out.png
  dehaze --force report out.png
  report report -o report.html
  grep -q '<h1>report</h1>' report.html || fail "another input"
}

labels_of() { grep -oE '<span>[^<]*</span></label>' "$1" | sed 's/<[^>]*>/ /g' | xargs; }

case_times() {
  make_input -f lavfi -i testsrc2=size=160x160:rate=1/30:duration=120 -c:v libx264 slow.mp4
  report slow.mp4 -o slow.html
  equal "$(labels_of slow.html)" "0.0 s 30.0 s 1:00 1:30"
  # Frames without time stamps follow each other at the stream's rate.
  make_video in.mp4 160x160 0.4
  make_input -i in.mp4 -c:v libx264 -x264opts bframes=0 in.h264
  report in.h264 -o raw.html
  equal "$(labels_of raw.html)" "0.0 s 0.1 s 0.2 s 0.2 s 0.3 s"
}

# Printers' profiles are longer than the picture.
case_large_profile() {
  command -v python3 >/dev/null || skip "python3 is not installed"
  make_picture plain.jpg 160x160 yuvj420p
  python3 -c '
data = open("plain.jpg", "rb").read()
segment = b"ICC_PROFILE\0\1\1" + b"p" * 20000
open("in.jpg", "wb").write(data[:2] + b"\xff\xe2" + (len(segment) + 2).to_bytes(2, "big") + segment + data[2:])'
  has_profile in.jpg
  report in.jpg -o out.html
  check_page out.html 1000000
  picture_of out.html 1
  ! ffprobe -v error -show_frames picture_1.jpg | holds 'ICC profile' || fail "20000 bytes in each picture"
}

# Pictures that are too long in every quality get smaller.
case_noise() {
  head -c $((1600 * 1600 * 3)) /dev/urandom >noise
  make_input -f rawvideo -pix_fmt rgb24 -s 1600x1600 -i noise in.png
  report --strength 50 in.png -o out.html
  check_page out.html 3000000
  picture_of out.html 1
  local width
  width=$(stream picture_1.jpg v width)
  [ "$width" -lt 1600 ] || fail "noise of $width columns"
}

run_case "$1"
