"""Writes tests/formulas/reference.hpp: values at 50 digits from definitions, integrals and roots.

    python3 scripts/series/reference.py > tests/formulas/reference.hpp
"""
from mpmath import mp, mpf, mpc, sin, cos, tan, atan, atanh, sinh, quad, sqrt, pi
from mpmath import arg, fabs

mp.dps = 50


def show(v):
    return mp.nstr(v, 19, min_fixed=-3, max_fixed=12)


def radians(degrees):
    return mpf(degrees) * pi / 180


def rectifying_arc(e2, lat):
    """The meridian's length from the equator over a."""
    return (1 - e2) * quad(lambda t: (1 - e2 * sin(t) ** 2) ** mpf(-1.5), [0, lat / 2, lat])


def authalic_q(e2, lat):
    return quad(lambda t: 2 * (1 - e2) * cos(t) / (1 - e2 * sin(t) ** 2) ** 2, [0, lat / 2, lat])


def isometric(e2, lat):
    """Complex latitudes too: the closed form, which latitudes() holds to quadrature."""
    e = sqrt(mpc(e2)) if e2 < 0 else sqrt(e2)
    s = sin(lat)
    v = atanh(s) - e * atanh(e * s)
    return v if isinstance(lat, mpc) else v.real


def latitudes(f, degrees):
    lat = radians(degrees)
    e2 = f * (2 - f)
    reduced = atan((1 - f) * tan(lat))
    rectifying = pi / 2 * rectifying_arc(e2, lat) / rectifying_arc(e2, pi / 2)
    psi = isometric(e2, lat)
    if lat < mpf("1.2"):  # quadrature converges slowly towards the pole's singularity
        integral = quad(lambda t: (1 - e2) / ((1 - e2 * sin(t) ** 2) * cos(t)), [0, lat / 2, lat])
        assert fabs(psi - integral) < mpf(10) ** -40
    conformal = atan(sinh(psi))
    authalic = mp.asin(authalic_q(e2, lat) / authalic_q(e2, pi / 2))
    return [lat, reduced, rectifying, conformal, authalic]


def transverse_mercator(f, lat, lon):
    """y + i x over a is the meridian's arc of the complex latitude at psi + i lambda."""
    e2 = f * (2 - f)
    psi = isometric(e2, lat)
    w = mpc(psi, lon)
    phi = 2 * mp.atan(mp.tanh(w / 2))
    for _ in range(12):
        slope = (1 - e2) / ((1 - e2 * sin(phi) ** 2) * cos(phi))
        phi -= (isometric(e2, phi) - w) / slope
    assert abs(isometric(e2, phi) - w) < mpf(10) ** -40
    # the arc along a straight path from the equator
    g = lambda t: phi * (1 - e2) * (1 - e2 * sin(phi * t) ** 2) ** mpf(-1.5)
    z = quad(g, [0, mpf(1) / 2, 1])
    # dz/dw = radius of the parallel at phi; its size over the true parallel is the scale
    nu = cos(phi) / sqrt(1 - e2 * sin(phi) ** 2)
    true = cos(lat) / sqrt(1 - e2 * sin(lat) ** 2)
    return z.imag, z.real, abs(nu) / true, -arg(nu)


WGS84 = 1 / mpf("298.257223563")


def main():
    print("// Written by scripts/series/reference.py: values worked out at 50 digits.")
    print("#pragma once\n")
    print("namespace tidewater::test {\n")
    print("// Radians: geodetic, reduced, rectifying, conformal, authalic.")
    print("struct LatitudeRow {")
    print("  double f;")
    print("  double lat[5];")
    print("};")
    print("inline constexpr LatitudeRow kLatitudes[] = {")
    tenth = 1 - sqrt(1 - mpf("0.01"))
    half = 1 - sqrt(1 - mpf("0.25"))
    nine = 1 - sqrt(1 - mpf("0.81"))
    for f in (WGS84, tenth, -mpf(1) / 250, half, nine):
        for degrees in ("0.001", "3", "17.5", "30", "45", "52.25", "68", "81", "89.5", "89.9999"):
            print("    {%s, {%s}}," % (show(f), ", ".join(show(v) for v in latitudes(f, degrees))))
    print("};\n")
    print("// A semi-major axis of one.  Degrees; eastings and northings, scale, and the bearing of grid north")
    print("// in radians.")
    print("struct TransverseMercatorRow {")
    print("  double f, lat, lon, x, y, scale, convergence;")
    print("};")
    print("inline constexpr TransverseMercatorRow kTransverseMercator[] = {")
    for f in (WGS84, mpf(1) / 150):
        for lat in ("0.0001", "5", "30", "45", "60", "75", "85", "89", "89.999"):
            for lon in ("0.0001", "1", "3", "9", "20", "34", "50", "80", "89"):
                if cos(radians(lat)) * sin(radians(lon)) < mpf("0.6"):
                    x, y, k, g = transverse_mercator(f, radians(lat), radians(lon))
                    print("    {%s, %s, %s, %s, %s, %s, %s}," %
                          (show(f), lat, lon, show(x), show(y), show(k), show(g)))
    print("};\n")
    print("}  // namespace tidewater::test")


main()
