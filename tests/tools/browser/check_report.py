#!/usr/bin/env python3
"""Uses a report page as people do: by mouse, keyboard and finger, on a desktop and a phone.

    check_report.py CHROMIUM PAGE.html [SCREENSHOT_FOLDER]
"""

import pathlib
import re
import sys

from devtools import Browser

KEYS = {"Tab": 9, "PageUp": 33, "PageDown": 34, "End": 35, "Home": 36, "ArrowLeft": 37,
        "ArrowRight": 39}
DESKTOP = (1280, 900, False)
PHONE = (390, 844, True)
SHOWN_STAGE = 'document.querySelector("figure.compare:not([hidden]) .stage")'


def expect(condition, message):
    if not condition:
        sys.exit("FAILED: " + message)


class ReportPage:
    def __init__(self, browser, url):
        self.browser = browser
        self.url = url

    def load(self, size):
        width, height, is_phone = size
        self.browser.call("Emulation.setDeviceMetricsOverride", width=width, height=height,
                          deviceScaleFactor=2 if is_phone else 1, mobile=is_phone)
        self.browser.call("Emulation.setTouchEmulationEnabled", enabled=is_phone)
        self.browser.events.clear()
        self.browser.call("Page.navigate", url=self.url)
        return self.browser.wait_for("Page.loadEventFired")

    def cut(self, side):
        """The edges that the divider cuts off a side, in per cent: right of before, left of after."""
        clip = self.browser.evaluate(
            f'getComputedStyle({SHOWN_STAGE}.querySelector(".{side}")).clipPath')
        # "inset(0px calc(100% - 30%) 0px 0px)" may be simplified to "inset(0px 70% 0px 0px)".
        percents = [float(p) for p in re.findall(r"([\d.]+)%", clip)]
        if "calc" in clip:
            return percents[0] - percents[1]
        return percents[0] if percents else 0

    def divider(self):
        """How much of the picture is before, in per cent; both sides must agree on it."""
        before = 100 - self.cut("before")
        after = self.cut("after")
        expect(abs(before - after) < 0.1, f"the sides are cut at {before} and {after}")
        return before

    def expect_divider(self, share, action, tolerance=0.6):
        place = self.divider()
        expect(abs(place - share) <= tolerance, f"{action}: divider at {place} %, not {share} %")
        box = self.box(SHOWN_STAGE)
        handle = self.box(SHOWN_STAGE + '.querySelector(".handle")')
        x = (handle["x"] + handle["width"] / 2 - box["x"]) / box["width"] * 100
        expect(abs(x - share) <= tolerance, f"{action}: handle at {x} %, not {share} %")
        label = self.browser.evaluate(
            SHOWN_STAGE + '.querySelector("input").getAttribute("aria-valuetext")')
        expect(label == f"{round(place)} % before", f"{action}: a screen reader says {label}")

    def box(self, expression):
        return self.browser.evaluate(f"{expression}.getBoundingClientRect().toJSON()")

    def point(self, share):
        box = self.box(SHOWN_STAGE)
        return {"x": box["x"] + box["width"] * share / 100, "y": box["y"] + box["height"] / 3}

    def press(self, key):
        for kind in ("rawKeyDown", "keyUp"):
            self.browser.call("Input.dispatchKeyEvent", type=kind, key=key, code=key,
                              windowsVirtualKeyCode=KEYS[key])

    def mouse(self, kind, share, pressed):
        self.browser.call("Input.dispatchMouseEvent", type=kind, button="left",
                          buttons=int(pressed), clickCount=1, **self.point(share))

    def touch(self, kind, share=None):
        points = [] if share is None else [self.point(share)]
        self.browser.call("Input.dispatchTouchEvent", type=kind, touchPoints=points)


def check_loading(page):
    """Nothing but the page itself is loaded, and nothing goes wrong."""
    events = page.load(DESKTOP)
    requests = [e["params"]["request"]["url"] for e in events
                if e.get("method") == "Network.requestWillBeSent"]
    foreign = [u for u in requests if u != page.url and not u.startswith("data:")]
    expect(not foreign, f"the page loads {foreign}")
    for event in events:
        expect(event.get("method") not in ("Runtime.exceptionThrown", "Log.entryAdded"),
               f"the browser complains: {event}")
    broken = page.browser.evaluate(
        "[...document.images].filter(i => !i.complete || i.naturalWidth === 0).length")
    expect(broken == 0, f"{broken} pictures are broken")


def check_keyboard(page):
    page.expect_divider(50, "at first")
    page.press("Tab")
    focused = page.browser.evaluate("document.activeElement.type")
    expect(focused == "range", f"the first Tab leads to {focused}")
    ring = page.browser.evaluate(
        f'getComputedStyle({SHOWN_STAGE}.querySelector(".handle"), "::after").outlineStyle')
    expect(ring == "solid", "the focus is not visible")
    for key, times, share in (("ArrowRight", 3, 53), ("ArrowLeft", 13, 40), ("PageUp", 1, 50),
                              ("Home", 1, 0), ("End", 1, 100), ("PageDown", 2, 80)):
        for _ in range(times):
            page.press(key)
        page.expect_divider(share, f"{key} x {times}")


def check_mouse(page):
    earlier = page.browser.screenshot()
    page.mouse("mousePressed", 30, True)
    page.expect_divider(30, "a press of the mouse")
    page.mouse("mouseMoved", 62, True)
    page.expect_divider(62, "a drag of the mouse")
    page.mouse("mouseReleased", 62, False)
    page.mouse("mouseMoved", 10, False)
    page.expect_divider(62, "a move of the mouse without its button")
    expect(page.browser.screenshot() != earlier, "the picture did not change")
    page.press("ArrowRight")
    page.expect_divider(63, "an arrow key after the mouse", 0.1 + 0.5)


def check_touch(page):
    page.touch("touchStart", 50)
    page.touch("touchMove", 35)
    page.touch("touchMove", 20)
    page.touch("touchEnd")
    page.expect_divider(20, "a swipe")
    page.touch("touchStart", 75)
    page.touch("touchEnd")
    page.expect_divider(75, "a tap")


def shown_views(page):
    return page.browser.evaluate(
        '[...new Set([...document.querySelectorAll("[data-view]")]'
        ".filter(e => !e.hidden).map(e => e.dataset.view))].join()")


def check_frames(page):
    """The frames of a video, one at a time; the divider keeps its place."""
    count = page.browser.evaluate('document.querySelectorAll(".frames input").length')
    if count == 0:
        return
    expect(count > 1, "a choice of a single frame")
    expect(shown_views(page) == "0", f"the first frame is not shown, but {shown_views(page)}")
    before = page.box('document.querySelector(".now")')["x"]
    place = page.divider()
    earlier = page.browser.screenshot()
    page.browser.evaluate('document.querySelector(".frames :checked").focus()')
    page.press("ArrowRight")
    expect(shown_views(page) == "1", f"after an arrow key {shown_views(page)} is shown")
    page.expect_divider(place, "another frame")
    expect(page.browser.screenshot() != earlier, "the other frame looks the same")
    moved = page.box('document.querySelector(".now")')["x"] - before
    expect(moved > 10, f"the mark in the charts moved by {moved} pixels")


def check_layout(page):
    for size in (DESKTOP, PHONE, (320, 568, True)):
        page.load(size)
        wide = page.browser.evaluate("document.documentElement.scrollWidth")
        expect(wide <= size[0], f"{wide} pixels wide on a screen of {size[0]}")
        stage = page.box(SHOWN_STAGE)
        expect(stage["y"] + stage["height"] <= size[1],
               f"the picture ends below the screen of {size[0]} x {size[1]}")


def check_dark_mode(page):
    colors = []
    for scheme in ("light", "dark"):
        page.browser.call("Emulation.setEmulatedMedia",
                          features=[{"name": "prefers-color-scheme", "value": scheme}])
        colors.append(page.browser.evaluate("getComputedStyle(document.body).backgroundColor"))
    brightness = [sum(int(n) for n in re.findall(r"\d+", c)[:3]) for c in colors]
    expect(brightness[0] > 600 > 150 > brightness[1], f"backgrounds {colors}")


def take_screenshots(page, folder):
    for scheme in ("light", "dark"):
        for name, size in (("desktop", DESKTOP), ("phone", PHONE)):
            page.browser.call("Emulation.setEmulatedMedia",
                              features=[{"name": "prefers-color-scheme", "value": scheme}])
            page.load(size)
            for part, whole in (("top", False), ("whole", True)):
                path = folder / f"{pathlib.Path(page.url).stem}_{name}_{scheme}_{part}.png"
                path.write_bytes(page.browser.screenshot(whole))


def main():
    program, path, *folder = sys.argv[1:]
    with Browser(program) as browser:
        page = ReportPage(browser, pathlib.Path(path).resolve().as_uri())
        check_loading(page)
        check_keyboard(page)
        check_mouse(page)
        check_frames(page)
        check_layout(page)
        page.load(PHONE)
        check_touch(page)
        check_dark_mode(page)
        if folder:
            take_screenshots(page, pathlib.Path(folder[0]))


main()
