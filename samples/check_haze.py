#!/usr/bin/env python3
"""Checks the stills of render.sh against the haze model:  check_haze.py OUTPUT_FOLDER

1. I = J*t + A*(1 - t) in display values, per pixel and channel, with t from the third picture.
2. t = exp(-d / FogDistance) on the asphalt, where d follows from the camera alone.

Needs ffmpeg to read the pictures. Ends with 1 when a bound is broken.
"""
import array
import math
import pathlib
import re
import subprocess
import sys

W, H, CLOCK = 1280, 720, 0.1
SCENE = (pathlib.Path(__file__).resolve().parent / "scene" / "street.pov").read_text()
DISTANCE = float(re.search(r"FogDistance = ([\d.]+);", SCENE).group(1))
LIGHT = [float(v) for v in re.search(r"FogLight = <(.+?)> / 255;", SCENE).group(1).split(",")]

# Asphalt only in this part of the still: no car, kerb or pavement.
ROAD_X, ROAD_Y = range(380, 640), range(520, 720)


def pixels(path, fmt, code):
    raw = subprocess.run(
        ["ffmpeg", "-v", "error", "-i", str(path), "-f", "rawvideo", "-pix_fmt", fmt, "-"],
        check=True, stdout=subprocess.PIPE).stdout
    values = array.array(code, raw)
    if len(values) != 3 * W * H:
        sys.exit(f"{path}: not {W} x {H}")
    if code == "H" and sys.byteorder == "big":
        values.byteswap()
    return values


def unit(v):
    n = math.sqrt(sum(c * c for c in v))
    return [c / n for c in v]


def cross(a, b):
    return [a[1] * b[2] - a[2] * b[1], a[2] * b[0] - a[0] * b[2], a[0] * b[1] - a[1] * b[0]]


def distance_to_ground(px, py):
    """Length of the camera ray through the middle of the pixel, down to the plane y = 0."""
    z = 9 * CLOCK
    eye = [0.0016 * z * z + 1.8, 1.9, z]
    at = [3.2 + 2.4 * CLOCK, 3.6, z + 40]
    ahead = unit([a - e for a, e in zip(at, eye)])
    right = unit(cross([0, 1, 0], ahead))
    up = cross(ahead, right)
    half = math.tan(math.radians(62 / 2))  # half the picture's width at distance 1
    sx = (2 * (px + 0.5) / W - 1) * half
    sy = (1 - 2 * (py + 0.5) / H) * half * H / W
    ray = unit([a + sx * r + sy * u for a, r, u in zip(ahead, right, up)])
    return -eye[1] / ray[1]


def main():
    if len(sys.argv) != 2:
        sys.exit(__doc__)
    folder = pathlib.Path(sys.argv[1])
    clear = pixels(folder / "street_clear.png", "rgb24", "B")
    hazy = pixels(folder / "street_hazy.png", "rgb24", "B")
    share = pixels(folder / "street_haze_share.png", "rgb48le", "H")  # 65535 * (1 - t)

    # Rounding alone: 0.5 in I and 0.5 * t in J. Along an edge the mean of J*t over the rays of a
    # pixel is not the product of the means, so the bound is asked for where t is even all around.
    t = [1 - share[3 * i] / 65535 for i in range(W * H)]
    inner, worst_inner, total = 0, 0.0, 0.0
    for y in range(1, H - 1):
        for x in range(1, W - 1):
            i = y * W + x
            e = max(abs(hazy[3 * i + c] - clear[3 * i + c] * t[i] - LIGHT[c] * (1 - t[i]))
                    for c in range(3))
            total += e
            around = t[i - W - 1:i - W + 2] + t[i - 1:i + 2] + t[i + W - 1:i + W + 2]
            if max(around) - min(around) < 0.005:
                inner += 1
                worst_inner = max(worst_inner, e)
    print(f"mean t                      {sum(t) / len(t):.3f}")
    print(f"nearest point               {-DISTANCE * math.log(max(t)):.1f} m")
    print(f"|I - J*t - A*(1-t)|         mean {total / ((W - 2) * (H - 2)):.2f} code values")
    print(f"  away from depth edges     max {worst_inner:.2f} "
          f"over {100 * inner / len(t):.0f} % of the pixels")

    worst = 0.0
    for py in ROAD_Y:
        for px in ROAD_X:
            expected = math.exp(-distance_to_ground(px, py) / DISTANCE)
            worst = max(worst, abs(t[py * W + px] - expected))
    print(f"|t - exp(-d/D)| on asphalt  max {worst:.5f} over {len(ROAD_X) * len(ROAD_Y)} pixels")

    print("   x   y       d       t   clear J        hazy I         model")
    for px, py in ((420, 700), (560, 640), (600, 580), (600, 540), (560, 522)):
        i = 3 * (py * W + px)
        d = distance_to_ground(px, py)
        td = math.exp(-d / DISTANCE)
        model = [clear[i + c] * td + LIGHT[c] * (1 - td) for c in range(3)]
        print(f"{px:4d} {py:3d} {d:6.2f} m {td:7.4f}   {tuple(clear[i:i + 3])!s:14} "
              f"{tuple(hazy[i:i + 3])!s:14} ({', '.join(f'{m:.1f}' for m in model)})")
    return 0 if worst_inner < 1.05 and worst < 0.0012 else 1


if __name__ == "__main__":
    sys.exit(main())
