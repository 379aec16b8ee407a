#!/usr/bin/env bash
# The page that dehaze report writes, in a real browser: see browser/check_report.py.
source "$(dirname "$0")/lib.sh"
checker=$(dirname "$(realpath "$0")")/browser/check_report.py

browse() {
  local browser
  browser=$(command -v chromium || command -v chromium-browser || command -v google-chrome) ||
    skip "there is no Chromium"
  command -v python3 >/dev/null || skip "there is no Python 3"
  python3 "$checker" "$browser" "$1"
}

case_picture() {
  make_picture in.png 640x480
  dehaze report in.png --reference in.png -o 'a page.html'
  browse 'a page.html'
}

case_portrait() {
  make_picture in.png 300x600
  dehaze report in.png -o page.html
  browse page.html
}

case_video() {
  make_video in.mp4 640x360 2
  dehaze report in.mp4 -o page.html
  browse page.html
}

run_case "$1"
