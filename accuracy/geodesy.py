"""Latitudes, frames, datum shifts, lines and the rest of the contract's functions."""

import struct
import tempfile

import mpmath as mp
import numpy as np
from geographiclib.geodesic import Geodesic

import formulas as f
from library import TRANSFORM, Triple, contract, points
from measure import (A, DEGREE, E, E2, FLAT, MP, Error, Row, apart, e, exactly, in_turn, on_the_ground,
                     relative, rounded, scatter)


def rows():
    return in_turn(latitudes, frames, attitudes, planes, datum, polynomials, grids, geodesics, rhumbs,
                   distortion)


def each(function, argument, values, result, **given):
    """A function of one number on many, the rest of its arguments given."""
    return np.array([contract(function, **{**given, argument: float(v)})[result][0] for v in values])


def latitudes():
    lats = np.linspace(-90, 90, 181)[1:-1] * DEGREE
    long = [mp.mpf(float(v)) for v in lats]

    def row(name, calls, truth, got, unit="m", size=1.0, inverse=None, note=""):
        error = np.array([size * abs(float(mp.mpf(float(g)) - t)) for t, g in zip(truth, got)])
        return Row(name, calls, "all latitudes, GRS 1980", MP, len(truth), Error.of(error, unit),
                   inverse, note=note)

    yield row("Radius of the parallel", "`TWRparal`", [A * f.parallel(e, v) for v in long],
              each("TWRparal", "lat", lats, "radius", a=A, e=E))
    yield row("Radius in the meridian", "`TWRmerid`", [A * f.rho(e, v) for v in long],
              each("TWRmerid", "lat", lats, "radius", a=A, e=E))
    yield row("Gaussian radius", "`TWgaussian_R`",
              [A * mp.sqrt(f.nu(e, v) * f.rho(e, v)) for v in long],
              each("TWgaussian_R", "lat", lats, "radius", a=A, e=E))
    surface = A * mp.sqrt(f.authalic(e, mp.pi / 2) / 2)
    got = contract("TWeq_surf_R", a=A, e=E)["radius"][0]
    yield Row("Radius of equal surface", "`TWeq_surf_R`", "GRS 1980", MP, 1,
              Error.of(np.array([abs(float(got - surface))])), note="a series in three terms")
    volume = A * (1 - e * e) ** (mp.mpf(1) / 6)
    got = contract("TWeq_vol_R", a=A, e=E)["radius"][0]
    yield Row("Radius of equal volume", "`TWeq_vol_R`", "GRS 1980", MP, 1,
              Error.of(np.array([abs(float(got - volume))])))
    arcs = [A * f.arc(e, v) for v in long]
    back = each("TWmerid_dist_i", "distance", [float(v) for v in arcs], "lat", a=A, e=E)
    yield row("Meridian arc", "`TWmerid_dist_f`, `TWmerid_dist_i`", arcs,
              each("TWmerid_dist_f", "lat", lats, "distance", a=A, e=E),
              inverse=Error.of(A * np.abs(back - lats)),
              note="a series; `src/formulas/meridian_arc.hpp` carries more terms")
    yield row("Derivative of the arc", "`TWdM_dphi`", [A * f.rho(e, v) for v in long],
              each("TWdM_dphi", "lat", lats, "derivative", a=A, e2=E2), note="metres a radian")
    chi = [f.conformal(e, v) for v in long]
    back = each("TWconflat_geod", "conformal_lat", [float(v) for v in chi], "lat", e=E)
    yield row("Conformal latitude", "`TWgeod_conflat`, `TWconflat_geod`", chi,
              each("TWgeod_conflat", "lat", lats, "conformal_lat", e=E), size=A,
              inverse=Error.of(A * np.abs(back - lats)))
    yield gravity(lats)


def gravity(lats):
    """The closed formula of normal gravity above the ellipsoid; the call takes a fixed gradient."""
    ge, gp = mp.mpf("9.7803267715"), mp.mpf("9.8321863685")
    b = A * mp.sqrt(1 - e * e)
    k = (b * gp - A * ge) / (A * ge)
    truth = [ge * (1 + k * mp.sin(mp.mpf(float(v))) ** 2)
             / mp.sqrt(1 - e * e * mp.sin(mp.mpf(float(v))) ** 2) for v in lats]
    got = each("TWnormal_grav", "lat", lats, "gravity", a=A, e=E, gamma_equator=float(ge),
               gamma_pole=float(gp), height=0.0)
    error = np.array([abs(float(mp.mpf(float(g)) - t)) for t, g in zip(truth, got)])
    return Row("Normal gravity", "`TWnormal_grav`", "height 0", "Somigliana, 50 digits", len(lats),
               Error.of(error, "m/s²"), note="above the ellipsoid a constant gradient of 3.086e-6 /s²")


def heights(place, low, high):
    return low + (high - low) * (np.arange(len(place)) * 0.6180339887498949 % 1)


def frames():
    place = scatter((-np.pi, -1.57), (np.pi, 1.57), 500)
    for low, high, name in ((-100, 9000, "near the ground"), (1e5, 4e7, "100 to 40,000 km up")):
        all_three = np.column_stack([place, heights(place, low, high)])
        exact = [[A * v for v in f.geocentric(e, *(mp.mpf(float(c)) for c in p[:2]),
                                              mp.mpf(float(p[2])) / A)] for p in all_three]
        got = points("TWllh_to_xyz", all_three, a=A, e=E)
        back = points("TWxyz_to_llh", rounded(exact), a=A, e=E)
        error = np.hypot(on_the_ground(A, all_three, back), all_three[:, 2] - back[:, 2])
        yield Row(f"Geocentric coordinates, {name}", "`TWllh_to_xyz`, `TWxyz_to_llh`",
                  "all latitudes", MP, 500, Error.of(apart(exact, got)), Error.of(error),
                  note="" if low < 0 else "systems layer by iteration")
    all_three = np.column_stack([scatter((0.1, 0.6), (0.5, 1.0), 300), np.full(300, 250.0)])
    lon0, lat0, h0 = 0.3, 0.8, 100.0
    given = {"a": A, "e": E, "scale": 1 / A, "lon0": lon0, "lat0": lat0, "h0": h0}
    exact = [[A * v for v in f.local(e, mp.mpf(lon0), mp.mpf(lat0), mp.mpf(float(p[0])),
                                     mp.mpf(float(p[1])), mp.mpf(250) / A, mp.mpf(h0) / A)]
             for p in all_three]
    given["scale"] = 1.0
    got = points("TWllh_to_lsr", all_three, **given)
    back = points("TWlsr_to_llh", rounded(exact), **given)
    error = np.hypot(on_the_ground(A, all_three, back), all_three[:, 2] - back[:, 2])
    # the call's unit is a times the scale
    unit = 1.0 if np.nanmax(apart(exact, got)) < 1e5 else A
    yield Row("East, north, up", "`TWllh_to_lsr`, `TWlsr_to_llh`", "within 1,500 km", MP, 300,
              Error.of(apart(exact, got * unit)), Error.of(error))
    k = contract("TWlsr_c", mode=1, a=A, e=E, lon0=lon0, lat0=lat0, h0=h0,
                 azimuth=np.array([np.pi / 2]))
    got = points("TWlsr_f", all_three, **k)
    exact_units = [[v / A for v in row] for row in exact]
    back = points("TWlsr_i", rounded(exact_units), **k)
    error = np.hypot(on_the_ground(A, all_three, back), all_three[:, 2] - back[:, 2])
    yield Row("Local space rectangular", "`TWlsr_c`, `TWlsr_f`, `TWlsr_i`", "within 1,500 km", MP, 300,
              Error.of(A * apart(exact_units, got)), Error.of(error))


def attitudes():
    """Angles there and back, and the matrix against the product of three rotations."""
    worst, matrix = [], []
    for i in range(300):
        omega, phi, kappa = (0.1 + 1.1 * v for v in ((i * 0.7548776662) % 1, (i * 0.569840291) % 1,
                                                     (i * 0.4301597) % 1))
        t = contract("TWopk_to_tsa", omega=omega, phi=phi, kappa=kappa)
        b = contract("TWtsa_to_opk", **{n: t[n] for n in ("tilt", "swing", "azimuth")})
        worst.append(max(abs(b[n][0] - v) for n, v in
                         (("omega", omega), ("phi", phi), ("kappa", kappa))))
        m = contract("TWcalc_matrix", omega=omega, phi=phi, kappa=kappa)["matrix"][:9].reshape(3, 3)
        so, co = mp.sin(omega), mp.cos(omega)
        sp, cp = mp.sin(phi), mp.cos(phi)
        sk, ck = mp.sin(kappa), mp.cos(kappa)
        turns = (mp.matrix([[cp, 0, -sp], [0, 1, 0], [sp, 0, cp]])
                 * mp.matrix([[1, 0, 0], [0, co, so], [0, -so, co]])
                 * mp.matrix([[ck, sk, 0], [-sk, ck, 0], [0, 0, 1]]))
        matrix.append(max(abs(float(turns[r, c] - m[r][c])) for r in range(3) for c in range(3)))
    yield Row("Attitude matrix", "`TWcalc_matrix`", "omega, phi, kappa 0.1 to 1.2",
              "product of three rotations, 50 digits", 300, Error.of(np.array(matrix), ""))
    yield Row("Attitude angles", "`TWopk_to_tsa`, `TWtsa_to_opk`", "omega, phi, kappa 0.1 to 1.2",
              "the way back", 300, None, Error.of(np.array(worst), "rad"))
    worst = []
    for i in range(300):
        tilt, swing, azimuth, lon, lat = (0.2 + 0.9 * ((i * r) % 1) for r in (0.75, 0.57, 0.43, 0.32,
                                                                              0.24))
        w = contract("TWtsa_toWxWyWz", tilt=tilt, swing=swing, azimuth=azimuth, lon=lon, lat=lat)
        b = contract("TWWxWyWzto_tsa", lon=lon, lat=lat, **{n: w[n] for n in ("wx", "wy", "wz")})
        turn = lambda d: abs((d + np.pi) % (2 * np.pi) - np.pi)
        worst.append(max(turn(b[n][0] - v) for n, v in
                         (("tilt", tilt), ("swing", swing), ("azimuth", azimuth))))
    yield Row("Geocentric rotations", "`TWtsa_toWxWyWz`, `TWWxWyWzto_tsa`", "angles 0.2 to 1.1",
              "the way back", 300, None, Error.of(np.array(worst), "rad"))


def planes():
    grid = scatter((-1, -1), (1, 1), 300)
    s1, s2, fe, fn = A, 0.9996, 5e5, 1e7
    exact = [[mp.mpf(float(x)) * s1 * mp.mpf(s2) + fe, mp.mpf(float(y)) * s1 * mp.mpf(s2) + fn]
             for x, y in grid]
    given = {"s1": s1, "s2": s2, "false_easting": fe, "false_northing": fn}
    got = points("TWab_to_en", grid, **given)
    back = points("TWen_to_ab", rounded(exact), **given)[:, :2]
    yield Row("Grid units", "`TWab_to_en`, `TWen_to_ab`", "a plane", MP, 300,
              Error.of(apart(exact, got)), Error.of(A * np.hypot(*(back - grid).T)))
    errors = []
    for x, y in (grid + 1) / 2:
        got = contract("TWbilinear_interpolation", p00=1.25, p01=-3.5, p10=7.75, p11=2.0, fx=x,
                       fy=y)["result"][0]
        lx, ly = mp.mpf(float(x)), mp.mpf(float(y))
        truth = (mp.mpf("1.25") * (1 - lx) * (1 - ly) - mp.mpf("3.5") * (1 - lx) * ly
                 + mp.mpf("7.75") * lx * (1 - ly) + 2 * lx * ly)
        errors.append(abs(float(mp.mpf(float(got)) - truth)))
    yield Row("Bilinear interpolation", "`TWbilinear_interpolation`", "a cell of values to 8", MP, 300,
              Error.of(np.array(errors), ""))
    errors = []
    for t in np.linspace(0, 2, 101):
        given = [np.float32(v) for v in (t, 1.25, 3.5, 2.75)]
        got = contract("TWqterp2", t=np.array([given[0]]), f0=np.array([given[1]]),
                       f1=np.array([given[2]]), f2=np.array([given[3]]))["result"][0]
        x = mp.mpf(float(given[0]))
        truth = mp.mpf("1.25") + x * mp.mpf("2.25") + x * (x - 1) / 2 * mp.mpf(-3)
        errors.append(abs(float(mp.mpf(float(got)) - truth)))
    yield Row("Newton's interpolation", "`TWqterp2`", "three values, single precision", MP, 101,
              Error.of(np.array(errors), ""))
    line = np.column_stack([scatter((0, 0), (100, 100), 41), np.zeros(41)])
    got = contract("TWpt_line_dist", points=line, count=41)["distance"][0]
    truth = mp.mpf(0)
    for i in range(1, 40, 2):
        a, p, b = ([mp.mpf(float(v)) for v in line[j, :2]] for j in (i - 1, i, i + 1))
        area = abs((b[0] - a[0]) * (a[1] - p[1]) - (a[0] - p[0]) * (b[1] - a[1]))
        truth = max(truth, area / mp.hypot(b[0] - a[0], b[1] - a[1]))
    yield Row("Distance from a chord", "`TWpt_line_dist`", "a line of 41 points", MP, 1,
              Error.of(np.array([abs(float(mp.mpf(float(got)) - truth))])))


def datum():
    rotation = np.array([1, 2e-5, -3e-5, -2e-5, 1, 1e-5, 3e-5, -1e-5, 1])
    place = np.column_stack([scatter((-6e6, -6e6), (6e6, 6e6), 300),
                             heights(np.zeros(300), -6e6, 6e6)])
    matrix = mp.matrix(3, 3)
    for i in range(9):
        matrix[i // 3, i % 3] = mp.mpf(float(rotation[i]))
    exact = []
    for p in place:
        v = matrix * mp.matrix([mp.mpf(float(c)) * (1 + mp.mpf(1e-6)) for c in p])
        exact.append([v[0] + 10, v[1] - 20, v[2] + 30])
    given = {"s": 1e-6, "rotation": rotation, "tx": 10.0, "ty": -20.0, "tz": 30.0}
    back = points("TWbw_i", points("TWbw_f", place, **given), **given)
    yield Row("Similarity, seven parameters", "`TWbw_f`, `TWbw_i`", "the earth", MP, 300,
              Error.of(apart(exact, points("TWbw_f", place, **given))),
              Error.of(np.linalg.norm(back - place, axis=1)),
              note="inverse by the transposed matrix: squares of the rotations are left; with an "
                   "orthogonal matrix to rounding")
    centre = [2e6, 1e6, 5e6]
    exact = []
    for p in place:
        v = matrix * mp.matrix([(mp.mpf(float(c)) - q) * (1 + mp.mpf(1e-6))
                                for c, q in zip(p, centre)])
        exact.append([v[i] + centre[i] + 9 for i in range(3)])
    given = {"s": 1e-6, "rotation": rotation}
    for name, value in zip(("x", "y", "z"), centre):
        given["p" + name], given["q" + name] = value, value + 9
    back = points("TWmol_bdk_i", points("TWmol_bdk_f", place, **given), **given)
    yield Row("Molodensky-Badekas", "`TWmol_bdk_f`, `TWmol_bdk_i`", "the earth", MP, 300,
              Error.of(apart(exact, points("TWmol_bdk_f", place, **given))),
              Error.of(np.linalg.norm(back - place, axis=1)), note="as above")
    exact = [[mp.mpf(float(c)) + d for c, d in zip(p, (mp.mpf("10.1"), -20, 30))] for p in place]
    given = {"dx": 10.1, "dy": -20.0, "dz": 30.0}
    yield Row("Three shifts", "`TWshifts_f`, `TWshifts_i`", "the earth", MP, 300,
              Error.of(apart(exact, points("TWshifts_f", place, **given))),
              Error.of(np.linalg.norm(points("TWshifts_i", rounded(exact), **given) - place, axis=1)))
    for name, a, inverse_f, shift in (
            ("105 m, Clarke 1866", 6378206.4, 294.9786982, (-8, 160, 176)),
            ("865 m, Bessel", 6377397.155, 299.1528128, (631, 23, 451))):
        yield molodensky(name, a, inverse_f, shift)


def molodensky(name, a, inverse_f, shift):
    ecc = float(np.sqrt((2 - 1 / inverse_f) / inverse_f))
    target_f = 1 / 298.257223563
    target_e = float(np.sqrt(target_f * (2 - target_f)))
    place = scatter((-np.pi, -89 * DEGREE), (np.pi, 89 * DEGREE), 500)
    place = np.column_stack([place, np.full(500, 100.0)])
    xyz = points("TWllh_to_xyz", place, a=a, e=ecc) + np.array(shift, float)
    exact = geodetic_of(xyz, 6378137.0, target_f)
    given = {"a": a, "e": ecc, "da": 6378137.0 - a, "df": target_f - 1 / inverse_f,
             **{k: float(v) for k, v in zip(("dx", "dy", "dz"), shift)}}
    got = points("TWmol_std_f", place, **given)
    error = np.hypot(on_the_ground(6378137.0, exact, got), exact[:, 2] - got[:, 2])
    back = points("TWmol_std_i", exact, **given)
    behind = np.hypot(on_the_ground(a, place, back), place[:, 2] - back[:, 2])
    row = Row(f"Molodensky, {np.linalg.norm(shift):.0f} m" + name[name.index(","):] + " to WGS 84",
              "`TWmol_std_f`, `TWmol_std_i`", "lat -89 to 89", "geocentric shift, by iteration", 500,
              Error.of(error), Error.of(behind),
              note="of the first order; the systems layer shifts geocentric coordinates")
    row.extra.update(place=place, error=error)
    return row


def geodetic_of(xyz, a, flat):
    """Geodetic coordinates by plain iteration to the end, in doubles."""
    e2 = flat * (2 - flat)
    rho = np.hypot(xyz[:, 0], xyz[:, 1])
    lat = np.arctan2(xyz[:, 2], rho * (1 - e2))
    for _ in range(30):
        n = a / np.sqrt(1 - e2 * np.sin(lat) ** 2)
        lat = np.arctan2(xyz[:, 2] + e2 * n * np.sin(lat), rho)
    n = a / np.sqrt(1 - e2 * np.sin(lat) ** 2)
    height = rho * np.cos(lat) + xyz[:, 2] * np.sin(lat) - a * a / n
    return np.column_stack([np.arctan2(xyz[:, 1], xyz[:, 0]), lat, height])


def polynomials():
    grid = scatter((-1, -1), (1, 1), 300)
    numbers = [[mp.mpf(float(v)) for v in p] for p in grid]

    def row(name, stem, given, truth, note=""):
        exact = [truth(*p) for p in numbers]
        got = points(stem + "_f", grid, **given, in_place=stem == "TWpoly2deg")
        back = points(stem + "_i", rounded(exact), **given)[:, :2]
        return Row(name, f"`{stem}_f`, `{stem}_i`", "the unit square", MP, 300,
                   Error.of(apart(exact, got), ""), Error.of(np.hypot(*(back - grid).T), ""),
                   note=note)

    c = [0.1, 0.2, 1, 0.01, 0.02, 0.03, 0.01, 0.02]
    complex_c = [mp.mpc(*map(mp.mpf, c[i:i + 2])) for i in range(0, 8, 2)]

    def complex_truth(x, y):
        z = mp.mpc(y, x)
        w = sum(k * z ** i for i, k in enumerate(complex_c))
        return w.imag, w.real

    yield row("Complex polynomial", "TWcomplexpol",
              {"order": 3, "y0": 0.0, "x0": 0.0, "sy": 1.0, "sx": 1.0, "coefs": np.array(c)},
              complex_truth)
    errors = []
    for x, y in numbers[:100]:
        z = mp.mpc(x, y)
        got = contract("TWcomplexpol_g", order=3, coefs=np.array(c), z_re=float(x),
                       z_im=float(y))["result"][:2]
        truth = sum(i * k * z ** (i - 1) for i, k in enumerate(complex_c) if i)
        errors.append(float(abs(mp.mpc(*map(float, got)) - truth)))
    yield Row("Derivative of a complex polynomial", "`TWcomplexpol_g`", "the unit square", MP, 100,
              Error.of(np.array(errors), ""))
    a, b = [0.1, 1, 0.02], [0.2, 0.02, 0.03]

    def conformal_truth(x, y):
        la, lb = [mp.mpf(v) for v in a], [mp.mpf(v) for v in b]
        return (la[0] + la[1] * x - lb[1] * y + la[2] * (x * x - y * y) - 2 * lb[2] * x * y,
                lb[0] + lb[1] * x + la[1] * y + lb[2] * (x * x - y * y) + 2 * la[2] * x * y)

    box = {"x0": 0.0, "y0": 0.0, "sx": 1.0, "sy": 1.0}
    yield row("Conformal polynomial", "TWconform2",
              {**box, **{f"a{i}": float(v) for i, v in enumerate(a)},
               **{f"b{i}": float(v) for i, v in enumerate(b)}}, conformal_truth)
    a, b = [0.1, 1, 0.01, 0.01, 0.02, 0.03], [0.2, 0.01, 1, 0.03, 0.02, 0.01]

    def second(x, y):
        terms = (1, x, y, x * x, x * y, y * y)
        return tuple(sum(mp.mpf(k) * t for k, t in zip(block, terms)) for block in (a, b))

    yield row("Polynomial of degree two", "TWpoly2deg",
              {**box, **{f"a{i}": float(v) for i, v in enumerate(a)},
               **{f"b{i}": float(v) for i, v in enumerate(b)}}, second)
    yield row("Polynomial of any degree", "TWnpoly2d", {"coefs": np.array(a + b), "d": 2}, second)
    yield regression()
    yield generic_inverse()




def regression():
    """Sums of powers, from terms that lie in memory as the library's record has them."""
    import ctypes
    import re
    from library import SOURCE, _core
    text = "".join(h.read_text() for h in (SOURCE / "include" / "tidewater").rglob("*.h"))
    record = re.search(r"typedef struct MreTerm \{(.*?)\} MreTerm;", text, re.S)[1]
    kinds = {"double": ctypes.c_double, "int16_t": ctypes.c_int16, "int32_t": ctypes.c_int32}
    found = [(name, kinds[kind], int(size or 0)) for kind, name, size in
             re.findall(r"(double|int16_t|int32_t)\s+(\w+)(?:\[(\d+)\])?;", record)]

    class Term(ctypes.Structure):
        _fields_ = [(n, k * s if s else k) for n, k, s in found]

    table = [(0.3, 0, 0), (0.2, 1, 0), (-0.1, 0, 1), (0.05, 2, 1), (0.02, 3, 3)]
    terms = (Term * 5)()
    for term, (c, u, v) in zip(terms, table):
        term.coefficient, term.power_u, term.power_v = c, u, v
    place = np.column_stack([scatter((-2, 0.4), (-1.2, 0.85), 300), np.full(300, 10.0)])
    out, status = np.zeros((300, 3)), np.zeros(1, np.uint32)
    call = _core.TWmre
    call.restype = None
    d, i32, i16, v = ctypes.c_double, ctypes.c_int32, ctypes.c_int16, ctypes.c_void_p
    call(i32(300), i16(1), i16(0), i32(5), i32(5), i32(5), d(0.05), d(97), d(-38), terms, terms,
         terms, v(place.ctypes.data), v(out.ctypes.data), v(status.ctypes.data))
    exact = []
    for p in place:
        lon, lat, h = (mp.mpf(float(c)) for c in p)
        big_u = mp.mpf(0.05) * (mp.degrees(lat) - 38)
        big_v = mp.mpf(0.05) * (mp.degrees(lon) + 97)
        total = sum(mp.mpf(c) * big_u ** a * big_v ** b for c, a, b in table)
        exact.append((A * (lon + mp.radians(total / 3600)), A * (lat + mp.radians(total / 3600)),
                      h + total))
    got = out * [A, A, 1]
    return Row("Multiple regression", "`TWmre`", "40 degrees of longitude", MP, 300,
               Error.of(apart(exact, got)), note="back: the same sums taken off, not iterated")


def generic_inverse():
    """Inverse of Mercator as a caller's map."""
    import ctypes

    @TRANSFORM
    def forward(_, count, given, out, status):
        source = (ctypes.c_double * (3 * count)).from_address(given)
        target = (ctypes.c_double * (3 * count)).from_address(out)
        row = points("TWmerc_f", [[source[0], source[1]]], e=E, lon0=0.0, y0=0.0)[0]
        target[0], target[1] = row[0], row[1]
        status[0] = 0x0FCF8009

    place = scatter((-1, -1.2), (1, 1.2), 60)
    exact = rounded(exactly(f.mercator(e, 0, 0), place))
    got = points("TWgeneric_i", exact, forward=forward, context=0)
    return Row("Inverse of any map", "`TWgeneric_i`", "Mercator, lat -69 to 69", MP, 60, None,
               Error.of(on_the_ground(A, place, got)))


def grids():
    """Made-up grids, whose files hold single precision, against the interpolation in 50 digits."""
    with tempfile.TemporaryDirectory() as folder:
        yield from shift_grids(folder + "/")


# A grid of 31 rows and 41 columns a quarter of a degree apart, from 100 W and 30 N.
ROWS, COLUMNS, STEP, WEST, SOUTH = 31, 41, 0.25, -100.0, 30.0


def node(which, row, column):
    return np.float32(which + 0.7 * np.sin(row * 0.3 + which) + 0.4 * np.cos(column * 0.2 * which))


def record_file(which):
    """A .las, .los or .geo file: records of a label and a row's values."""
    head = b"T" * 64 + struct.pack("<iiifffff", COLUMNS, ROWS, 1, WEST, STEP, SOUTH, STEP, 0.0)
    text = head + b"\0" * (4 * (COLUMNS + 1) - len(head))
    for row in range(ROWS):
        text += struct.pack("<f", 0.0)
        text += b"".join(struct.pack("<f", node(which, row, c)) for c in range(COLUMNS))
    return text


def national_file():
    """An .gsb file; its columns run west, its longitudes are positive west."""
    number = lambda key, v: key.ljust(8).encode() + struct.pack("<ii", v, 0)
    real = lambda key, v: key.ljust(8).encode() + struct.pack("<d", v)
    words = lambda key, v: key.ljust(8).encode() + v.ljust(8).encode()
    text = number("NUM_OREC", 11) + number("NUM_SREC", 11) + number("NUM_FILE", 1)
    text += words("GS_TYPE", "SECONDS") + words("VERSION", "NTv2.0")
    text += words("SYSTEM_F", "OLD") + words("SYSTEM_T", "NEW")
    text += b"".join(real(k, 6378137.0) for k in ("MAJOR_F", "MINOR_F", "MAJOR_T", "MINOR_T"))
    text += words("SUB_NAME", "ALL") + words("PARENT", "NONE")
    text += words("CREATED", "") + words("UPDATED", "")
    north, east = SOUTH + (ROWS - 1) * STEP, WEST + (COLUMNS - 1) * STEP
    for key, v in (("S_LAT", SOUTH), ("N_LAT", north), ("E_LONG", -east), ("W_LONG", -WEST),
                   ("LAT_INC", STEP), ("LONG_INC", STEP)):
        text += real(key, v * 3600)
    text += number("GS_COUNT", ROWS * COLUMNS)
    for row in range(ROWS):
        for c in reversed(range(COLUMNS)):
            text += struct.pack("<ffff", node(1, row, c), node(2, row, c), -1, -1)
    return text + real("END", 0.0)


def interpolated(which, lon, lat, order=1):
    """The value in a cell: bilinear, or of the second order on the three nearest rows and columns."""
    x = (mp.degrees(mp.mpf(float(lon))) - mp.mpf(WEST)) / mp.mpf(STEP)
    y = (mp.degrees(mp.mpf(float(lat))) - mp.mpf(SOUTH)) / mp.mpf(STEP)
    if order == 1:
        c, r = int(mp.floor(x)), int(mp.floor(y))
    else:
        c, r = int(mp.nint(x)) - 1, int(mp.nint(y)) - 1
    fx, fy = x - c, y - r
    value = lambda i, j: mp.mpf(float(node(which, r + i, c + j)))

    def along(i):
        v = [value(i, j) for j in range(order + 1)]
        first = v[0] + fx * (v[1] - v[0])
        return first if order == 1 else first + fx * (fx - 1) / 2 * (v[2] - 2 * v[1] + v[0])

    v = [along(i) for i in range(order + 1)]
    first = v[0] + fy * (v[1] - v[0])
    return first if order == 1 else first + fy * (fy - 1) / 2 * (v[2] - 2 * v[1] + v[0])


def shift_grids(folder):
    for name, which in (("grid.las", 1), ("grid.los", 2), ("grid.geo", 20)):
        with open(folder + name, "wb") as file:
            file.write(record_file(which))
    with open(folder + "grid.gsb", "wb") as file:
        file.write(national_file())
    place = np.column_stack([scatter((-99 * DEGREE, 31 * DEGREE), (-91 * DEGREE, 36.5 * DEGREE), 200),
                             np.full(200, 10.0)])
    second = DEGREE / 3600
    shifted = np.array([[p[0] - float(interpolated(2, *p[:2])) * second,
                         p[1] + float(interpolated(1, *p[:2])) * second] for p in place])
    for kind, name in (("nadcon", "NADCON grids"), ("cnt", "National transformation grids")):
        with open(folder + "area.par", "w") as file:
            file.write("grid\n")
        control = np.zeros(40000)
        given = {"directory": folder.encode(), "control": control} if kind == "nadcon" else {
            "directory": folder.encode()}
        contract(f"TW{kind}_c", **given)
        got = points(f"TW{kind}_f", place, **given)
        back = points(f"TW{kind}_i", np.column_stack([shifted, place[:, 2]]), **given)
        yield Row(name, f"`TW{kind}_c`, `TW{kind}_f`, `TW{kind}_i`", "a grid of 0.25 degrees",
                  "bilinear, 50 digits", 200, Error.of(on_the_ground(A, shifted, got)),
                  Error.of(on_the_ground(A, place, back)))
    with open(folder + "area.par", "w") as file:
        file.write(" " * 15 + "grid\n")
    control = np.zeros(40000)
    contract("TWgeo90_c", directory=folder.encode(), control=control)
    got = points("TWgeo90_f", place, control=control)
    truth = np.array([float(interpolated(20, *p[:2], order=2)) for p in place])
    back = points("TWgeo90_i", got, control=control)
    yield Row("Geoid grids", "`TWgeo90_c`, `TWgeo90_f`, `TWgeo90_i`", "a grid of 0.25 degrees",
              "second order, 50 digits", 200, Error.of(np.abs(got[:, 2] - place[:, 2] - truth)),
              Error.of(np.abs(back[:, 2] - place[:, 2])), note="single precision; inverse: the way back")


def geodesic_inverse(pairs):
    g = Geodesic(A, FLAT)
    truth, got = [], []
    for lon1, lat1, lon2, lat2 in pairs:
        truth.append(g.Inverse(lat1, lon1, lat2, lon2))
        c = contract("TWgeodesic_inv", start=(lon1 * DEGREE, lat1 * DEGREE, 0),
                     end=(lon2 * DEGREE, lat2 * DEGREE, 0), a=A, e=E)
        got.append((c["distance"][0], c["azimuth"][0], c["back_azimuth"][0]))
    return truth, np.array(got)


def lines_strewn(count, longest):
    """Starts, azimuths and lengths, and the ends by GeographicLib."""
    g = Geodesic(A, FLAT)
    start = scatter((-180, -80), (180, 80), count)
    azimuth = (np.arange(count) * 137.50776405) % 360 - 180
    length = longest * (0.02 + 0.98 * ((np.arange(count) * 0.7548776662) % 1))
    ends = [g.Direct(lat, lon, azi, s) for (lon, lat), azi, s in zip(start, azimuth, length)]
    return start, azimuth, length, ends


def geodesics():
    for longest, name, road in ((1e6, "to 1,000 km", ""), (1e7, "to 10,000 km", ""),
                                (1.9e7, "to 19,000 km", "nearly antipodal points are not solved")):
        start, azimuth, length, _ = lines_strewn(400, longest)
        error, along = solved(start, azimuth, length)
        row = Row(f"Geodesics, {name}", "`TWgeodesic_dir`, `TWgeodesic_inv`",
                  "lat -80 to 80, all azimuths", "GeographicLib", 400, Error.of(error), Error.of(along),
                  note=(road + "; " if road else "") + "systems layer: Karney's, nanometres everywhere")
        row.extra.update(azimuth=azimuth, length=length, along=np.array(along), lat=start[:, 1])
        yield row
    yield from east_and_west()
    yield from past_a_pole()
    yield integral()
    yield densified()


def solved(start, azimuth, length):
    """Errors of TWgeodesic_dir's ends and of TWgeodesic_inv's lengths."""
    g = Geodesic(A, FLAT)
    error, along = [], []
    for (lon, lat), azi, s in zip(start, azimuth, length):
        end = g.Direct(lat, lon, azi, s)
        c = contract("TWgeodesic_dir", start=(lon * DEGREE, lat * DEGREE, 0), azimuth=azi * DEGREE,
                     distance=s, a=A, e=E)
        error.append(on_the_ground(A, np.array([[end["lon2"], end["lat2"]]]) * DEGREE,
                                   np.array([c["end"][:2]]))[0])
        c = contract("TWgeodesic_inv", start=(lon * DEGREE, lat * DEGREE, 0),
                     end=(end["lon2"] * DEGREE, end["lat2"] * DEGREE, 0), a=A, e=E)
        along.append(abs(c["distance"][0] - s))
    return np.array(error), np.array(along)


def east_and_west():
    """Lines that leave close to due east or west, in equal parts by the logarithm of how close."""
    count = 1000
    i = np.arange(count)
    start = scatter((-180, -70), (180, 70), count)
    close = 10.0 ** (6 * ((i * 0.7548776662) % 1) - 6) * np.where(i % 4 < 2, 1, -1)
    azimuth = np.where(i % 2 == 0, 90.0, -90.0) + close
    for shortest, longest, name in ((5e4, 5e5, "50 to 500 km"), (5e5, 1.5e7, "500 to 15,000 km")):
        length = shortest * (longest / shortest) ** ((i * 0.5698402910) % 1)
        error, along = solved(start, azimuth, length)
        yield Row(f"Geodesics near due east and west, {name}", "`TWgeodesic_dir`, `TWgeodesic_inv`",
                  "1e-6 to 1 degree from due east or west at the start", "GeographicLib", count,
                  Error.of(error), Error.of(along),
                  note=f"{100 * np.mean(along > 1e-3):.0f} lengths in 100 are off by more than 1 mm; "
                       "systems layer: Karney's, nanometres everywhere")


def past_a_pole():
    """Lines whose vertex lies next to a pole, and next to the equator."""
    count = 400
    i = np.arange(count)
    close = 10.0 ** (6 * ((i * 0.7548776662) % 1) - 6) * DEGREE
    length = 1.9e7 * (0.02 + 0.98 * ((i * 0.5698402910) % 1))
    start = scatter((-180, -80), (180, 80), count)
    # sin(azimuth) cos(reduced latitude) is the sine of the vertex's distance from the pole
    reduced = np.arctan((1 - FLAT) * np.tan(start[:, 1] * DEGREE))
    azimuth = np.arcsin(np.sin(close) / np.cos(reduced)) / DEGREE
    error, along = solved(start, azimuth, length)
    yield Row("Geodesics past a pole", "`TWgeodesic_dir`, `TWgeodesic_inv`",
              "1e-6 to 1 degree from the pole, to 19,000 km", "GeographicLib", count, Error.of(error),
              Error.of(along))
    start = np.column_stack([scatter((-180, 0), (180, 1), count)[:, 0], np.zeros(count)])
    error, along = solved(start, 90 - close / DEGREE, length)
    yield Row("Geodesics along the equator", "`TWgeodesic_dir`, `TWgeodesic_inv`",
              "1e-6 to 1 degree from due east on it, to 19,000 km", "GeographicLib", count, Error.of(error),
              Error.of(along))


def integral():
    """Length and longitude from the vertex, by the integrals of Bessel in 50 digits."""
    errors = []
    b, ep2 = A * (1 - FLAT), E2 / (1 - E2)
    for k in np.linspace(0.1, 0.99, 12):
        for share in (0.0, 0.3, 0.7, 0.95):
            x = k * share
            c = contract("geodesic_int", x=x, k=k, flag=0, b=b, e2=E2, ep2=ep2)
            cosine2 = mp.mpf(E2) / (1 - mp.mpf(E2)) * mp.mpf(float(k)) ** 2
            sigma = mp.asin(mp.mpf(float(x)) / mp.mpf(float(k)))
            truth = mp.quad(lambda s: mp.mpf(b) * mp.sqrt(1 + cosine2 * mp.sin(s) ** 2),
                            [sigma, mp.pi / 2])
            errors.append(abs(float(mp.mpf(float(c["arc"][0])) - truth)))
    return Row("Arc from the vertex", "`geodesic_int`", "vertices of 6 to 82 degrees",
               "Bessel's integral, 50 digits", len(errors), Error.of(np.array(errors)),
               note="five terms")


def densified():
    g = Geodesic(A, FLAT)
    start, end = (-5.0, 48.0), (60.0, -20.0)
    c = contract("TWgeodesic_buf", mode=0, start=(start[0] * DEGREE, start[1] * DEGREE, 0),
                 end=(end[0] * DEGREE, end[1] * DEGREE, 0), spacing=0.0, a=A, e=E, count=101,
                 points=np.zeros((101, 3)))
    line = g.InverseLine(start[1], start[0], end[1], end[0])
    truth = np.array([[p["lon2"], p["lat2"]] for p in
                      (line.Position(line.s13 * i / 100) for i in range(101))]) * DEGREE
    return Row("Points along a geodesic", "`TWgeodesic_cnt`, `TWgeodesic_buf`",
               "a line of 9,900 km, 101 points", "GeographicLib", 101,
               Error.of(on_the_ground(A, truth, c["points"])),
               note="systems layer: Karney's, nanometres everywhere")


def rhumb_truth(lon, lat, azimuth, length):
    """The end of a rhumb line by its closed formulas (Bowring 1985), degrees, 50 digits."""
    lat, azi = mp.radians(mp.mpf(float(lat))), mp.radians(mp.mpf(float(azimuth)))
    m = f.arc(e, lat) + mp.mpf(float(length)) / A * mp.cos(azi)
    end = m
    for _ in range(100):
        step = (f.arc(e, end) - m) / f.rho(e, end)
        end -= step
        if abs(step) < mp.mpf(10) ** -45:
            break
    across = mp.tan(azi) * (f.isometric(e, end) - f.isometric(e, lat))
    return float(mp.radians(mp.mpf(float(lon))) + across), float(end)


def rhumbs():
    count = 200
    start = scatter((-120, -60), (120, 60), count)
    azimuth = (np.arange(count) * 137.50776405) % 360 - 180
    length = 2e6 * (0.02 + 0.98 * ((np.arange(count) * 0.7548776662) % 1))
    error, along = [], []
    for (lon, lat), azi, s in zip(start, azimuth, length):
        end = rhumb_truth(lon, lat, azi, s)
        c = contract("TWrhmbline_dir", start=(lon * DEGREE, lat * DEGREE, 0), azimuth=azi * DEGREE,
                     distance=s, a=A, e=E)
        got = c["end"][:2]
        error.append(on_the_ground(A, np.array([end]), np.array([got]))[0])
        c = contract("TWrhmbline_inv", start=(lon * DEGREE, lat * DEGREE, 0), end=(*end, 0), a=A, e=E)
        along.append(abs(c["distance"][0] - s))
    yield Row("Rhumb lines", "`TWrhmbline_dir`, `TWrhmbline_inv`", "lat -60 to 60, to 2,000 km", MP,
              count, Error.of(np.array(error)), Error.of(np.array(along)),
              note="digits are lost near the parallel; systems layer keeps them")
    c = contract("TWrhmbline_buf", mode=1, start=(-0.1, 0.8, 0), end=(0, 0, 0), distance=3e6,
                 azimuth=2.0, spacing=0.0, a=A, e=E, count=31, points=np.zeros((31, 3)))
    truth = np.array([rhumb_truth(-0.1 / DEGREE, 0.8 / DEGREE, 2.0 / DEGREE, 1e5 * i)
                      for i in range(31)])
    yield Row("Points along a rhumb line", "`TWrhmbline_cnt`, `TWrhmbline_buf`",
              "a line of 3,000 km, 31 points", MP, 31, Error.of(on_the_ground(A, truth, c["points"])))


def distortion():
    """Jacobians of Mercator by differences, and the scales and convergence made of them."""
    import ctypes

    @TRANSFORM
    def forward(_, count, given, out, status):
        source = np.array((ctypes.c_double * (3 * count)).from_address(given)).reshape(-1, 3)
        target = (ctypes.c_double * (3 * count)).from_address(out)
        plane = points("TWmerc_f", source, e=E, lon0=0.0, y0=0.0)
        plane[:, 2] = source[:, 2]
        target[:] = list((plane * [A, A, 1]).ravel())
        status[0] = 0x0FCF8009

    place = scatter((-1, -1.2), (1, 1.2), 60)
    three = np.column_stack([place, np.zeros(60)])
    c = contract("TWget_jacobian", transform=forward, step0=1e-5, step1=1e-5, step2=1.0, count=60,
                 jacobians=np.zeros((60, 9)), **{"in": three})
    scales = points("TWJ_to_scales", three, a=A, e=E, jacobians=c["jacobians"])
    truth = [1 / f.parallel(e, mp.mpf(float(p[1]))) for p in place]
    worst = np.maximum(relative(truth, scales[:, 0]), relative(truth, scales[:, 1]))
    convergence = contract("TWJ_to_merconv", count=60, jacobians=c["jacobians"],
                           out=np.zeros(60))["out"]
    yield Row("Local distortion", "`TWget_jacobian`, `TWJ_to_scales`", "Mercator, steps of 1e-5", MP,
              60, None, None, Error.of(worst, ""),
              note="differences of the second order; systems layer of the sixth")
    yield Row("Meridian convergence", "`TWJ_to_merconv`, `TWJ_to_slopes`", "Mercator, steps of 1e-5",
              "zero", 60, Error.of(np.abs(convergence), "rad"))
