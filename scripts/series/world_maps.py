#!/usr/bin/env python3
"""Prints figures of world maps of the unit sphere at 40 digits, for tests/systems.

Snyder, Map Projections: A Working Manual (1987): Mollweide p. 251, Eckert IV p. 256, van der
Grinten p. 241, each from its own equations by root finding with mpmath.
"""

import mpmath as mp

mp.mp.dps = 60


def mollweide(lon, lat):
    t = mp.findroot(lambda z: z - mp.sin(z) - mp.pi * (1 - mp.sin(lat)),
                    mp.cbrt(6 * mp.pi * (1 - mp.sin(lat)))) if lat < mp.pi / 2 else mp.mpf(0)
    theta = (mp.pi - t) / 2
    return 2 * mp.sqrt(2) / mp.pi * lon * mp.cos(theta), mp.sqrt(2) * mp.sin(theta)


def eckert_4(lon, lat):
    if lat < mp.pi / 2:
        v2 = (2 + mp.pi / 2) * (1 - mp.sin(lat))
        s = mp.findroot(lambda s: s - mp.sin(s) * mp.cos(s) + 2 * (1 - mp.cos(s)) - v2,
                        mp.sqrt(v2) / (1 + mp.sqrt(v2) / 8))
    else:
        s = mp.mpf(0)
    t = mp.pi / 2 - s
    return (2 / mp.sqrt(mp.pi * (4 + mp.pi)) * lon * (1 + mp.cos(t)),
            2 * mp.sqrt(mp.pi / (4 + mp.pi)) * mp.sin(t))


def van_der_grinten(lon, lat):
    theta = mp.asin(2 * lat / mp.pi)
    A = (mp.pi / lon - lon / mp.pi) / 2
    G = mp.cos(theta) / (mp.sin(theta) + mp.cos(theta) - 1)
    P = G * (2 / mp.sin(theta) - 1)
    Q = A * A + G
    root = mp.sqrt(A**2 * (G - P**2)**2 - (P**2 + A**2) * (G**2 - P**2))
    x = mp.pi * (A * (G - P**2) + root) / (P**2 + A**2)
    y = mp.pi * (P * Q - A * mp.sqrt((A**2 + 1) * (P**2 + A**2) - Q**2)) / (P**2 + A**2)
    return x, y


for name in (mollweide, eckert_4, van_der_grinten):
    for lat in (1e-7, 17.0, 45.0, 80.0, 89.5, 89.99, 89.9999, 89.999999, 89.99999999):
        x, y = name(mp.radians(mp.mpf(100)), mp.radians(mp.mpf(lat)))
        print(f'    {{"{name.__name__.replace("_", " ")}", {lat!r}, {mp.nstr(x, 19)}, {mp.nstr(y, 19)}}},')
