"""Writes tests/formulas/rhumb_lines.hpp: rhumb lines on WGS 84 by quadrature at 40 digits.

    python3 scripts/series/rhumb_lines.py > tests/formulas/rhumb_lines.hpp
"""
import random

from mpmath import mp, mpf, sin, cos, tan, asin, atanh, sqrt, pi, quad, linspace

mp.dps = 40
A = mpf(6378137)
F = 1 / mpf("298.257223563")
E2 = F * (2 - F)
E = sqrt(E2)
C2 = A * A / 2 * (1 + (1 - E2) * atanh(E) / E)


def element(p):
    return A * (1 - E2) * (1 - E2 * sin(p) ** 2) ** mpf(-1.5)


def arc(p, q):
    return quad(element, linspace(p, q, 4))


def psi(p):
    return atanh(sin(p)) - E * atanh(E * sin(p))


def sine_authalic(p):
    def q(s):
        return s / (1 - E2 * s * s) + atanh(E * s) / E
    return q(sin(p)) / q(mpf(1))


def line(lat1, azimuth, length):
    p1 = mpf(lat1) * pi / 180
    alpha = mpf(azimuth) * pi / 180
    if azimuth in (90, -90):  # a parallel
        radius = A * cos(p1) / sqrt(1 - E2 * sin(p1) ** 2)
        lon = mpf(length) / radius * (1 if azimuth > 0 else -1)
        return p1, lon, C2 * lon * sine_authalic(p1)
    d = mpf(length) * cos(alpha)
    p2 = p1
    for _ in range(8):
        p2 -= (arc(p1, p2) - d) / element(p2)
    if abs(p2) > pi / 2:
        return None
    lon = tan(alpha) * (psi(p2) - psi(p1))
    slope = lambda p: sine_authalic(p) * (1 - E2) / ((1 - E2 * sin(p) ** 2) * cos(p))
    return p2, lon, C2 * tan(alpha) * quad(slope, linspace(p1, p2, 6))


def show(v):
    return mp.nstr(v, 20, min_fixed=-3, max_fixed=20)


def main():
    random.seed(68)
    u = random.uniform
    rows = [(u(-80, 80), u(-180, 180), u(0, 8e6)) for _ in range(30)]
    rows += [(u(-80, 80), random.choice([-90, 90]), u(0, 1e7)) for _ in range(5)]
    rows += [(u(-80, 80), 90 + random.choice([-1, 1]) * 10 ** u(-13, -2), u(0, 1e7))
             for _ in range(10)]
    rows += [(u(-80, 80), u(-180, 180), 10 ** u(-3, 3)) for _ in range(5)]
    rows += [(u(85, 89.5), u(100, 180), u(0, 8e6)) for _ in range(5)]
    print("// Written by scripts/series/rhumb_lines.py: rhumb lines on WGS 84 at 40 digits.")
    print("#pragma once\n")
    print("namespace tidewater::test {\n")
    print("// Degrees, metres, square metres; the longitude of the end is not brought within half a turn.")
    print("struct RhumbLineRow {")
    print("  double lat1, azimuth, length, lat2, lon2, area;")
    print("};")
    print("inline constexpr RhumbLineRow kRhumbLines[] = {")
    for lat1, azimuth, length in rows:
        end = line(lat1, azimuth, length)
        if end is None:
            continue
        print("    {%r, %r, %r, %s, %s, %s}," % (lat1, azimuth, length, show(end[0] * 180 / pi),
                                                 show(end[1] * 180 / pi), show(end[2])))
    print("};\n")
    print("}  // namespace tidewater::test")


main()
