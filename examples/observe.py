#!/usr/bin/env python3
"""Makes the references of examples/chantier.geo agree with its known points.

The example's stations, known points and measures are kept; each Reference
line gets the horizontal angle, zenith angle and slope distance that an
instrument set up on the station would read, given the orientation chosen
below, the book's distance correction (FACTOR, as `carnet compute` reports
it) and its instrument (collimation CV, prism constant C0), with a little
deterministic noise so that the checks have something to show.

    python3 examples/observe.py FACTOR < examples/chantier.geo > new.geo
"""
import math
import re
import sys

FACTOR = float(sys.argv[1])
CV, C0, R = 0.0012, 0.0, 6366000.0
# The true orientation of each set-up, and the heights not in the book.
V0 = {"S1": 23.45670, "S2": 118.22330, "S3": 301.77880, "S4": 77.00210}
HEIGHTS = {"S2": 153.0208, "S4": 153.2460}
NOISE = [0.0004, -0.0006, 0.0003, -0.0002, 0.0005, -0.0003, 0.0002, -0.0004]


def grads(rad):
    return rad * 200 / math.pi


def turn(g):
    return g % 400.0


lines = sys.stdin.buffer.read().split(b"\n")
points = {}
for line in lines:
    w = line.split()
    if len(w) >= 6 and w[1] == b"Point":
        x, y, z = float(w[4]), float(w[5]), float(w[6])
        if x != -999999.0:
            points[w[2].decode()] = [x, y, z if z != -999999.0 else HEIGHTS.get(w[2].decode())]

station, hi, k = None, 0.0, 0
out = []
for line in lines:
    w = line.split()
    if len(w) >= 3 and w[1] == b"Station":
        station, hi = w[2].decode(), float(w[3])
    elif len(w) >= 4 and w[1] == b"Reference" and station:
        target = w[2].decode()
        xs, ys, zs = points[station]
        xt, yt, zt = points[target]
        bearing = turn(grads(math.atan2(xt - xs, yt - ys)))
        ah = turn(bearing - V0[station] + NOISE[k % len(NOISE)])
        if len(w) == 4:  # a direction only: "Reference R100 AH"
            line = re.sub(rb"\s[0-9.]+\s*$", b" %.7f" % ah, line)
        else:
            hp = float(w[3])
            dh = math.hypot(xt - xs, yt - ys) / FACTOR
            # The zenith angle that gives the height difference, curvature
            # and refraction included, then the slope distance.
            dz = zt - zs - hi + hp - 0.87 * dh * dh / (2 * R)
            zenith = grads(math.atan2(dh, dz))
            slope = dh / math.sin(zenith * math.pi / 200) - C0 + NOISE[(k + 3) % len(NOISE)] * 4
            fields = b"%10.6f %12.7f %12.7f %11.6f" % (hp, ah, zenith + CV, slope)
            line = re.sub(rb"(Reference\s+\S+\s+)\S+\s+\S+\s+\S+\s+\S+", lambda m: m.group(1) + fields, line)
        k += 1
    out.append(line)
sys.stdout.buffer.write(b"\n".join(out))
