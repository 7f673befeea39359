"""The families of map projections, as the contract's functions give them."""

import mpmath as mp
import numpy as np
from geographiclib.geodesic import Geodesic

import formulas as f
from library import contract, points
from measure import (A, DEGREE, E, MP, Error, Row, apart, distortions, e, exactly, in_turn,
                     on_the_ground, relative, rounded, scatter)


def geographic(low, high, count=400):
    return scatter(np.array(low) * DEGREE, np.array(high) * DEGREE, count)


def family(name, stem, domain, box, reference, constants=None, lon0=0.0, axis=A, ecc=E,
           against=MP, scale=None, k0=1.0, note="", count=400, unit=1.0, forward=None,
           inverse=None, scale_in_place=False, scale_name=None, more=None, parts=()):
    """A row: forward, inverse and scale of a stem's functions on a box of degrees.

    unit scales the reference to the function's own unit; scale tells which distortion stands in
    elements x and y of the scale function's output.
    """
    k = dict(constants or {})
    k.update(e=ecc, lon0=lon0)
    k.update(more or {})
    place = geographic(*box, count)
    exact = [[v * unit for v in row] for row in exactly(reference, place)]
    forward = stem + "_f" if forward is None else forward
    inverse = stem + "_i" if inverse is None else inverse
    calls = []
    got = points(forward, place, **k)
    row = Row(name, "", domain, against, count, Error.of(axis * apart(exact, got)), note=note)
    row.extra.update(place=place, error=axis * apart(exact, got))
    calls.append(forward)
    if inverse:
        back = points(inverse, rounded(exact), **k)
        row.inverse = Error.of(on_the_ground(axis, place, back))
        calls.append(inverse)
    if scale:
        scale_name = scale_name or stem + "_s"
        truth = distortions(mp.mpf(ecc), reference, place)
        got = points(scale_name, place, in_place=scale_in_place, **{**k, "k0": k0})
        worst = np.zeros(count)
        for column, which in enumerate(scale):
            wanted = [mp.mpf(1) * k0 if which == 1 else t[which] * k0 for t in truth]
            worst = np.maximum(worst, relative(wanted, got[:, column]))
        row.scale = Error.of(worst, "")
        calls.append(scale_name)
    row.calls = "`" + "`, `".join([*calls, *parts]) + "`"
    return row


def rad(*degrees):
    return [mp.mpf(float(d) * DEGREE) for d in degrees]


def exact_cassini(a, fl, lon, lat):
    """Cassini's x, y by the geodesic that meets the central meridian at a right angle."""
    g = Geodesic(a, fl)
    chord = g.Inverse(lat, -lon, lat, lon)
    line = g.Line(lat, -lon, chord["azi1"])
    foot = line.Position(chord["s12"] / 2)["lat2"]
    return np.copysign(chord["s12"] / 2, lon), g.Inverse(0, 0, foot, 0)["s12"] * np.sign(foot)


def geodesic_row(name, stem, domain, box, reference, constants, more, note, scale=None, count=400,
                 in_place=False):
    """As family(), where the truth is in metres by GeographicLib."""
    degrees = scatter(*box, count)
    place = degrees * DEGREE
    exact = np.array([reference(*p) for p in degrees]) / A
    k = {**constants, **more, "e": E}
    got = points(stem + "_f", place, **k)
    error = A * np.hypot(*(got[:, :2] - exact).T)
    back = points(stem + "_i", exact, **k)
    row = Row(name, f"`{stem}_f`, `{stem}_i`", domain, "GeographicLib", count, Error.of(error),
              Error.of(on_the_ground(A, place, back)), note=note)
    row.extra.update(place=place, error=error)
    return row


def rows():
    return in_turn(cylinders, cones, azimuthal, oblique, world, special)


def cylinders():
    yield family("Mercator", "TWmerc", "lat -89 to 89", ((-180, -89), (180, 89)),
                 f.mercator(e, 0, *rad(10)), contract("TWmerc_c", e=E, lat0=10 * DEGREE),
                 scale=("k", "k"))
    yield family("Miller cylindrical", "TWmiller_cyl", "sphere, lat -89.9 to 89.9",
                 ((-180, -89.9), (180, 89.9)), f.miller(0, 0),
                 contract("TWmiller_cyl_c", lat0=0), ecc=0.0, scale=("k", "h"))
    yield family("Equirectangular", "TWcyl_eqr", "sphere, all latitudes",
                 ((-180, -89.9), (180, 89.9)), f.equirectangular(0, 0, *rad(10, 40)),
                 contract("TWcyl_eqr_c", lat1=40 * DEGREE), ecc=0.0,
                 more={"lat0": 10 * DEGREE}, scale=("k", 1))
    tm = contract("TWt_merc_c", e=E, lat0=0)
    for width, note in ((3, ""), (10, ""), (35, "systems layer: Krueger's series, nm to 3,900 km")):
        yield family(f"Transverse Mercator, {width} degrees", "TWt_merc",
                     f"lon within {width}, lat -84 to 84", ((-width, -84), (width, 84)),
                     f.transverse_mercator(e, 0, 0), tm, more={"lat0": 0.0}, scale=("k", "k"),
                     note=note or "meridian series; systems layer: nm", count=300)
    yield family("Transverse Mercator, next to the poles", "TWt_merc", "lon within 3, lat 84 to 89.9",
                 ((-3, 84), (3, 89.9)), f.transverse_mercator(e, 0, 0), tm, more={"lat0": 0.0},
                 note="By contract the inverse takes the sphere where the series departs from it", count=200)
    yield scaled_transverse(tm)
    gauss = contract("TWgaussII_c", e=E, lat0=45 * DEGREE)
    _, _, _, _, mapping = f.gauss_sphere(e, rad(45)[0])
    yield family("Gauss conformal sphere", "TWgaussII", "lat -89 to 89, sphere at 45 N",
                 ((-150, -89), (150, 89)), mapping, gauss)
    yield sphere_scale(gauss)
    plane = f.gauss_sphere(e, rad(45)[0])
    c, t = plane[0], plane[1]
    grid = scatter((-2, -3), (2, 3), 400)
    exact = [(c * mp.mpf(float(x)), c * (mp.mpf(float(y)) + t)) for x, y in grid]
    yield Row("Mercator planes of ellipsoid and sphere", "`TWgauII_f`, `TWgauII_i`",
              "the Mercator plane", MP, 400,
              Error.of(A * apart(exact, points("TWgauII_f", grid, **gauss))),
              Error.of(A * np.hypot(*(points("TWgauII_i", rounded(exact), **gauss)[:, :2] - grid).T)))
    yield schreiber(gauss)


def scaled_transverse(tm):
    place = geographic((-3, -84), (3, 84), 200)
    reference = f.transverse_mercator(e, 0, 0)
    rows_in = np.column_stack([place, np.ones(len(place))])
    out = np.ones_like(rows_in)
    got = contract("TWt_merc_xyk", **{**tm, "k0": 1.0, "lon0": 0.0, "in": rows_in, "out": out,
                                      "count": len(place)})["out"]
    truth = [t["k"] for t in distortions(e, reference, place)]
    return Row("Transverse Mercator with scale", "`TWt_merc_xyk`", "lon within 3, lat -84 to 84", MP,
               200, Error.of(A * apart(exactly(reference, place), got)), None,
               Error.of(relative(truth, got[:, 2]), ""))


def sphere_scale(gauss):
    place = geographic((-150, -85), (150, 85), 200)
    c, _, radius, _, mapping = f.gauss_sphere(e, rad(45)[0])
    got = points("TWgaussII_s", np.column_stack([place, np.ones(len(place))]), in_place=True,
                 **{**gauss, "e": E, "lon0": 0.0, "k0": 1.0})
    truth = [radius * c * mp.cos(mapping(0, mp.mpf(float(p[1])))[1])
             / f.parallel(e, mp.mpf(float(p[1]))) for p in place]
    return Row("Gauss conformal sphere, scale", "`TWgaussII_s`", "lat -85 to 85, sphere at 45 N", MP,
               200, None, None, Error.of(relative(truth, got[:, 2]), ""))


def schreiber(gauss):
    """Conformal sphere, then its transverse Mercator, in place."""
    place = geographic((-6, 20), (6, 70), 200)
    _, _, radius, chi0, mapping = f.gauss_sphere(e, rad(45)[0])
    tm = contract("TWt_merc_c", e=0.0, lat0=float(chi0))
    sphere = f.transverse_mercator(0, 0, mp.mpf(float(chi0)))
    reference = lambda lon, lat: sphere(*mapping(lon, lat))
    k = {**tm, **gauss, "e": E, "lon0": 0.0, "k0": 1.0}
    got = points("TWg_schreiber", np.column_stack([place, np.ones(len(place))]), in_place=True, **k)
    truth = [t["k"] * radius for t in distortions(e, reference, place)]
    return Row("Gauss-Schreiber", "`TWg_schreiber`", "lon within 6, lat 20 to 70", MP, 200,
               Error.of(A * apart(exactly(reference, place), got)), None,
               Error.of(relative(truth, got[:, 2]), ""))


def cones():
    lat0, lat1, lat2 = 46.5 * DEGREE, 44 * DEGREE, 49 * DEGREE
    m = [mp.mpf(v) for v in (lat0, lat1, lat2)]
    given = dict(e=E, lat0=lat0, lat1=lat1, lat2=lat2)
    yield family("Lambert conformal conic", "TWlam", "cone of 44 and 49 N, lat -60 to 89",
                 ((-180, -60), (180, 89)), f.lambert_conformal(e, 0, *m), contract("TWlam_c", **given),
                 scale=("k", "k"))
    yield family("Albers equal-area conic", "TWalbers", "cone of 44 and 49 N, lat -60 to 89",
                 ((-180, -60), (180, 89)), f.albers(e, 0, *m), contract("TWalbers_c", **given),
                 scale=("k", "h"))
    yield family("Equidistant conic", "TWconic", "cone of 44 and 49 N, lat -60 to 89",
                 ((-180, -60), (180, 89)), f.equidistant_conic(e, 0, *m),
                 contract("TWconic_c", **given), scale=("k", 1),
                 note="meridian series; the systems layer's is exact")
    yield family("Polyconic", "TWpolycon", "lon within 30, lat -80 to 80", ((-30, -80), (30, 80)),
                 f.polyconic(e, 0, *rad(10)), contract("TWpolycon_c", e=E, lat0=10 * DEGREE),
                 scale=(1, "h"), note="meridian series; the systems layer's is exact")
    bonne = contract("TWbonne_c", e=E, lat1=45 * DEGREE)
    yield family("Bonne", "TWbonne", "lon within 60, lat -60 to 85", ((-60, -60), (60, 85)),
                 f.bonne(e, 0, mp.mpf(45 * DEGREE)), bonne, scale=(1, "h"),
                 note="scale by the sphere's formula; systems layer's factors are the ellipsoid's")
    yield imw_row()
    yield krovak_row()
    yield oblique_lambert_row()
    yield bipolar_row()
    yield bipolar_scale()
    yield from state_plane()


def bipolar_scale():
    p = contract("TWbipocc_param")
    k = {**p, **contract("TWbipocc_c", **{n: p[n] for n in ("lon_a", "lat_a", "lat_b", "ab", "z1",
                                                            "z2")}), "k0": 1.0}
    place = geographic((-108, -35), (-55, 60), 200)
    truth = [t["k"] for t in distortions(mp.mpf(0), f.bipolar(), place)]
    got = points("TWbipocc_s", place, **k)
    return Row("Bipolar oblique conic, scale", "`TWbipocc_s`", "sphere, 108 to 55 W, 35 S to 60 N", MP,
               200, None, None, Error.of(relative(truth, got[:, 0]), ""),
               note="that of the cones: the strip between them, not conformal, is left out of it")


def imw_row():
    lat1 = mp.radians(40)
    k = contract("TWIMWmodPoly_c", e=E, lon0=0.0, lat1=float(lat1))
    return family("Modified polyconic (IMW)", "TWIMWmodPoly", "a sheet, lat 40 to 44, lon within 3",
                  ((-3, 40), (3, 44)), f.imw(e, 0, mp.mpf(float(lat1))), k, count=200)


def krovak_row():
    a, inverse_f = 6377397.155, 299.1528128
    ecc = float(np.sqrt((2 - 1 / inverse_f) / inverse_f))
    lon0, lat0 = (24 + 50 / 60) * DEGREE, 49.5 * DEGREE
    k = contract("TWkrovak_c", e=ecc, lon0=lon0, lat0=lat0, d1=0.0, d2=0.0, azimuth=0.0,
                 use_azimuth=0, pole_lon=np.array([lon0]),
                 pole_lat=np.array([59.75 * DEGREE]))
    radius = contract("TWgaussian_R", a=1.0, e=ecc, lat=lat0)["radius"][0]
    reference = f.krovak(mp.mpf(ecc))
    row = family("Krovak", "TWo_lam", "12 to 23 E, 47 to 51 N", ((12, 47), (23, 51)), reference, k,
                 lon0=lon0, axis=a * radius, ecc=ecc, unit=1 / mp.mpf(float(radius)),
                 more={"turn": 0.0}, count=200)
    row.calls = "`TWkrovak_c`, `TWo_lam_f`, `TWo_lam_i`"
    return row


def oblique_lambert_row():
    lon0, lat0, pole_lon, pole_lat = (v * DEGREE for v in (0, 45, 0, 60))
    k = contract("TWo_lam_c", e=E, lon0=lon0, lat0=lat0, d1=-3 * DEGREE, d2=4 * DEGREE, azimuth=0.0,
                 use_azimuth=0, pole_lon=np.array([pole_lon]), pole_lat=np.array([pole_lat]))
    reference = f.oblique_lambert(e, *(mp.mpf(v) for v in (lon0, lat0, -3 * DEGREE, 4 * DEGREE,
                                                            pole_lon, pole_lat)))
    row = family("Oblique Lambert", "TWo_lam", "lon within 12, lat 35 to 55", ((-12, 35), (12, 55)),
                 reference, k, more={"turn": 0.0}, scale=("k", "k"), count=200)
    row.note = "scale of the cone alone, without that of the conformal sphere"
    return row


def bipolar_row():
    p = contract("TWbipocc_param")
    k = {**p, **contract("TWbipocc_c", **{n: p[n] for n in ("lon_a", "lat_a", "lat_b", "ab", "z1",
                                                            "z2")})}
    degrees = scatter((-110, -40), (-50, 60), 400)
    exact = rounded(exactly(f.bipolar(), degrees * DEGREE))
    got = points("TWbipocc_f", degrees * DEGREE, **k)[:, :2]
    size = 6370997.0
    back = on_the_ground(size, degrees * DEGREE, points("TWbipocc_i", got, **k))
    row = Row("Bipolar oblique conic", "`TWbipocc_f`, `TWbipocc_i`",
              "sphere, 110 to 50 W, 40 S to 60 N", MP, 400,
              Error.of(size * np.hypot(*(got - exact).T)), Error.of(back),
              note="inverse: the way back, whose iteration ends at 1e-10")
    row.extra.update(place=degrees * DEGREE, error=back)
    return row


def state_plane():
    """Zones are parameters; the error is that of the family that a zone names."""
    from pyproj import CRS, Transformer
    worst = {}
    for kind, codes in (("83", {"0101": 26929, "0405": 26945, "5001": 26931, "3104": 32118}),
                        ("27", {"0101": 26729, "0404": 26744, "5001": 26731})):
        for zone, code in codes.items():
            z = contract("TWspcs" + kind, zone_text=zone.encode())
            if z["status"] != 0x0FCF8009:
                continue
            crs = CRS.from_epsg(code)
            ellipsoid = crs.ellipsoid
            a, ecc = ellipsoid.semi_major_metre, float(
                np.sqrt((2 - 1 / ellipsoid.inverse_flattening) / ellipsoid.inverse_flattening))
            unit = crs.axis_info[0].unit_conversion_factor
            box = crs.area_of_use
            degrees = scatter((box.west, box.south), (box.east, box.north), 100)
            direct = Transformer.from_crs(crs.geodetic_crs, crs, always_xy=True)
            exact = np.column_stack(direct.transform(*degrees.T)) * unit
            yield_type = int(z["type"][0])
            lon0, lat0, k0 = z["lon0"][0], z["lat0"][0], z["k0"][0]
            if yield_type == 0:
                k = contract("TWt_merc_c", e=ecc, lat0=lat0)
                plane = points("TWt_merc_f", degrees * DEGREE, **{**k, "lon0": lon0})
            elif yield_type == 1:
                k = contract("TWlam_c", e=ecc, lat0=lat0, lat1=z["lat1"][0], lat2=z["lat2"][0])
                plane = points("TWlam_f", degrees * DEGREE, **{**k, "lon0": lon0})
            else:
                k = contract("TWo_merc_c", mode=1, e=ecc, lon_c=z["lon_center"][0],
                             lat_c=z["lat_center"][0], alpha=np.array([z["azimuth"][0]]),
                             lat0=np.array([z["lat_center"][0]]))
                plane = points("TWo_merc_f", degrees * DEGREE, **k)
            got = plane[:, :2] * a * k0 + [z["false_easting"][0], z["false_northing"][0]]
            worst.setdefault(kind, []).append(np.hypot(*(got - exact).T))
    for kind, errors in worst.items():
        errors = np.concatenate(errors)
        yield Row(f"State plane 19{kind}", f"`TWspcs{kind}` and its projection",
                  f"{len(errors) // 100} zones, one at least of each type", "PROJ", len(errors),
                  Error.of(errors), note="transverse zones to the millimetre; systems layer exact")


def azimuthal():
    lat0 = 50 * DEGREE
    yield family("Stereographic, oblique", "TWstereo", "within 90 degrees of 50 N",
                 ((-80, 0), (80, 85)), f.stereographic(e, 0, mp.mpf(lat0)),
                 contract("TWstereo_c", e=E, lat0=lat0), more={"lat0": lat0}, scale=("k", "k"))
    yield family("Stereographic, polar", "TWstereo", "lat 0 to 89.9", ((-180, 0), (180, 89.9)),
                 f.stereographic(e, 0, mp.pi / 2), contract("TWstereo_c", e=E, lat0=np.pi / 2),
                 more={"lat0": np.pi / 2}, scale=("k", "k"))
    double = contract("TWstereo3_c", e=E, lat0=lat0)
    radius = float(f.gauss_sphere(e, mp.mpf(lat0))[2])
    yield family("Double stereographic", "TWstereo3", "within 60 degrees of 50 N",
                 ((-60, 0), (60, 85)), f.double_stereographic(e, 0, mp.mpf(lat0)), double,
                 more={"lat0": lat0}, axis=A * radius)
    laea = contract("TWlam_az_eq_c", e=E, lat0=lat0)
    yield family("Lambert azimuthal equal-area", "TWlam_az_eq", "lon within 90, lat -30 to 89",
                 ((-90, -30), (90, 89)), f.azimuthal_equal_area(e, 0, mp.mpf(lat0)), laea,
                 more={"lat0": lat0}, scale=("most", "least"),
                 note="oblique scale by the sphere's formula; systems layer's factors are the ellipsoid's")
    polar = contract("TWlam_az_eq_c", e=E, lat0=np.pi / 2)
    yield family("Lambert azimuthal equal-area, polar", "TWlam_az_eq", "lat 1 to 89.9",
                 ((-180, 1), (180, 89.9)), f.azimuthal_equal_area(e, 0, mp.pi / 2), polar,
                 more={"lat0": np.pi / 2}, scale=("k", "h"))
    yield family("Gnomonic", "TWgnomon", "sphere, within 80 degrees of 50 N", ((-60, 0), (60, 85)),
                 f.gnomonic(0, mp.mpf(lat0)), contract("TWgnomon_c", lat0=lat0), ecc=0.0,
                 more={"lat0": lat0}, scale=("least", "most"))
    ortho = contract("TWortho_c", e=E, lon0=0.0, lat0=lat0)
    yield scale_row("Orthographic, scale", "TWortho_s", f.orthographic(e, 0, mp.mpf(lat0)), E,
                    {"lon0": 0.0, "lat0": lat0}, ((-50, 10), (50, 80)), ("most", "least"),
                    "right on the ellipsoid too")
    yield scale_row("Azimuthal equidistant, scale", "TWaz_eq_s",
                    f.azimuthal_equidistant_sphere(0, mp.pi / 2), 0.0,
                    {"lon0": 0.0, "lat0": np.pi / 2}, ((-170, 5), (170, 89)), ("most", "least"),
                    "sphere, polar; elsewhere not a number; systems layer's factors have no such limit")
    yield family("Orthographic", "TWortho", "within 75 degrees of 50 N", ((-60, 0), (60, 85)),
                 f.orthographic(e, 0, mp.mpf(lat0)), ortho, more={"lat0": lat0, "a": A})
    height = 5e6
    persp = contract("TWpersp_c", a=A, e=E, lat0=lat0, h=height, h0=0.0)
    yield family("Vertical perspective", "TWpersp_vert", "from 5,000 km above 50 N, within 45 degrees",
                 ((-40, 15), (40, 80)), f.perspective(e, 0, mp.mpf(lat0), mp.mpf(height) / mp.mpf(A)),
                 persp, more={"lat0": lat0, "a": A, "h": height})
    yield tilted(persp, lat0, height)
    g = Geodesic(A, 1 / 298.257222101)

    def equidistant(lon, lat):
        line = g.Inverse(50, 0, lat, lon)
        return line["s12"] * np.sin(line["azi1"] * DEGREE), line["s12"] * np.cos(
            line["azi1"] * DEGREE)

    k = contract("TWaz_eq_c", e=E, lat0=lat0)
    for reach, box in ((100, ((-1.2, 49.3), (1.2, 50.7))), (600, ((-7, 45.5), (7, 54.5))),
                       (2000, ((-25, 34), (25, 65))), (5000, ((-60, 10), (60, 85)))):
        yield geodesic_row(f"Azimuthal equidistant, {reach:,} km", "TWaz_eq",
                           f"about {reach:,} km round 50 N", box, equidistant, k,
                           {"lon0": 0.0, "lat0": lat0},
                           "systems layer: the geodesics themselves, nm over the whole earth")
    cassini = contract("TWcassini_c", e=E, lat0=0.0)
    for width in (2, 6):
        yield geodesic_row(f"Cassini, {width} degrees", "TWcassini",
                           f"lon within {width}, lat -80 to 80", ((-width, -80), (width, 80)),
                           lambda lon, lat: exact_cassini(A, 1 / 298.257222101, lon, lat), cassini,
                           {"lon0": 0.0, "lat0": 0.0},
                           "a series; the registry's method is the same series, so is the systems "
                           "layer's")
    yield cassini_scale(cassini)


def scale_row(name, call, reference, ecc, given, box, columns, note):
    place = geographic(*box, 200)
    truth = distortions(mp.mpf(ecc), reference, place)
    got = points(call, place, **{**given, "k0": 1.0})
    worst = np.zeros(200)
    for column, which in enumerate(columns):
        worst = np.maximum(worst, relative([t[which] for t in truth], got[:, column]))
    return Row(name, f"`{call}`", f"lat {box[0][1]} to {box[1][1]}", MP, 200, None, None,
               Error.of(worst, ""), note=note)


def cassini_scale(cassini):
    g = Geodesic(A, 1 / 298.257222101)
    degrees = scatter((-5, -80), (5, 80), 200)
    truth = []
    for lon, lat in degrees:
        line = g.Line(lat, -lon, g.Inverse(lat, -lon, lat, lon)["azi1"])
        half = g.Inverse(lat, -lon, lat, lon)["s12"] / 2
        foot = line.Position(half)
        truth.append(mp.mpf(1 / g.Direct(foot["lat2"], 0, foot["azi2"], half,
                                         outmask=Geodesic.ALL)["M12"]))
    got = points("TWcassini_s", degrees * DEGREE, in_place=True,
                 **{**cassini, "e": E, "lon0": 0.0, "k0": 1.0})
    return Row("Cassini, scale", "`TWcassini_s`", "lon within 5, lat -80 to 80", "GeographicLib", 200,
               None, None, Error.of(relative(truth, got[:, 1]), ""), note="two terms of a series")


def tilted(persp, lat0, height):
    from pyproj import Proj
    degrees = scatter((-20, 35), (20, 65), 200)
    tilt, azimuth = 20.0, 0.0
    peer = Proj(f"+proj=tpers +h={height} +lat_0=50 +R={A} +tilt={tilt} +azi={azimuth}")
    exact = np.column_stack(peer(*degrees.T))
    sphere = contract("TWpersp_c", a=A, e=0.0, lat0=lat0, h=height, h0=0.0)
    k = {**sphere, "a": A, "e": 0.0, "lon0": 0.0, "lat0": lat0, "h": height, "h0": 0.0,
         "tilt_a": 0.0, "tilt_b": tilt * DEGREE, "rot": np.pi}
    got = points("TWpersp_f", degrees * DEGREE, **k)[:, :2] * A
    back = points("TWpersp_i", got / A, **k)
    return Row("Tilted perspective", "`TWpersp_f`, `TWpersp_i`", "sphere, tilt of 20 degrees", "PROJ",
               200, Error.of(np.hypot(*(np.abs(got) - np.abs(exact)).T)),
               Error.of(on_the_ground(A, degrees * DEGREE, back)), note="inverse: the way back")


def oblique():
    lon_c, lat_c, azimuth = 115 * DEGREE, 4 * DEGREE, 53.3 * DEGREE
    k = contract("TWo_merc_c", mode=1, e=E, lon_c=lon_c, lat_c=lat_c, lat0=np.array([lat_c]),
                 alpha=np.array([azimuth]))
    yield family("Hotine oblique Mercator", "TWo_merc", "lon within 10, lat -6 to 14",
                 ((105, -6), (125, 14)), f.hotine(e, *(mp.mpf(v) for v in (lon_c, lat_c, azimuth))),
                 k, lon0=float(k["lon0"][0]), scale=("k", "k"), count=300,
                 parts=("TWo_merc_uv_k", "TWo_merc_rot"))
    skew = float(np.arcsin(-0.6))
    k = contract("TWrso_c", e=E, lon_c=lon_c, lat_c=lat_c, skew=skew)
    yield family("Rectified skew orthomorphic", "TWrso", "lon within 10, lat -6 to 14",
                 ((105, -6), (125, 14)), f.rectified_skew(e, *(mp.mpf(v) for v in (lon_c, lat_c,
                                                                                   skew))),
                 {**k, "skew": skew}, lon0=float(k["lon0"][0]), scale=("k", "k"), count=300)
    lon0, lat0, az = 46.43 * DEGREE, -18.9 * DEGREE, 18.9 * DEGREE
    k = contract("TWlaborde_c", e=E, lon0=lon0, lat0=lat0, azimuth=az)
    yield family("Laborde", "TWlaborde", "Madagascar, lon within 4, lat -27 to -11",
                 ((42.5, -27), (50.5, -11)),
                 f.laborde(e, mp.mpf(lon0), mp.mpf(lat0), mp.mpf(az)), k, lon0=lon0,
                 more={"mode": 1}, axis=A * float(k["R"][0]), count=200)
    yield from laborde_parts(k, lon0, lat0, az)


def laborde_parts(k, lon0, lat0, azimuth):
    place = geographic((43.5, -26), (49.5, -12), 200)
    reference = f.laborde(e, mp.mpf(lon0), mp.mpf(lat0), mp.mpf(azimuth))
    radius = f.gauss_sphere(e, mp.mpf(lat0))[2]
    truth = [t["k"] * radius for t in distortions(e, reference, place)]
    got = points("TWlaborde_s", np.column_stack([place, np.ones(200)]), in_place=True,
                 **{**k, "lon0": lon0, "k0": 1.0})
    yield Row("Laborde, scale", "`TWlaborde_s`, `TWlabor_s`", "lon within 3, lat -26 to -12", MP, 200,
              None, None, Error.of(relative(truth, got[:, 0]), ""),
              note="By contract the cubic's constant is exchanged; systems layer's factors are right")
    plane = scatter((-0.1, -0.15), (0.1, 0.15), 200)
    cubic = mp.mpc(1 - mp.cos(2 * mp.mpf(azimuth)), mp.sin(2 * mp.mpf(azimuth))) / 12

    def truth_of(x, y):
        w = mp.mpc(y, x)
        z = w + cubic * w ** 3
        return z.imag, z.real

    exact = exactly(truth_of, plane)
    back = points("TWlabor_i", rounded(exact), **{**k, "mode": 1})[:, :2]
    yield Row("Laborde's cubic", "`TWlabor_f`, `TWlabor_i`", "a plane of Madagascar", MP, 200,
              Error.of(A * apart(exact, points("TWlabor_f", plane, **k))),
              Error.of(A * np.hypot(*(back - plane).T)))


def world():
    yield family("Sinusoidal", "TWsinusoidal", "lat -89.9 to 89.9", ((-180, -89.9), (180, 89.9)),
                 f.sinusoidal(e, 0), contract("TWsinusoidal_c", e=E, lat0=0.0), more={"lat0": 0.0},
                 scale=(1, "h"))
    size = 6370997.0
    yield family("Mollweide", "TWmollweide", "sphere, lat -89.5 to 89.5", ((-180, -89.5), (180, 89.5)),
                 f.mollweide(0), contract("TWmollweide_c", lat0=0.0), axis=size, ecc=0.0)
    yield family("Mollweide, next to the poles", "TWmollweide", "sphere, lat 89.5 to 89.999",
                 ((-180, 89.5), (180, 89.999)), f.mollweide(0), contract("TWmollweide_c", lat0=0.0),
                 axis=size, ecc=0.0, count=200)
    yield family("Eckert IV", "TWeckertIV", "sphere, lat -89.9 to 89.9", ((-180, -89.9), (180, 89.9)),
                 f.eckert4(0), contract("TWeckertIV_c", lat0=0.0), axis=size, ecc=0.0)
    yield family("Van der Grinten", "TWvdg", "sphere, lat -89 to 89, off the axes",
                 ((-179, 0.1), (-0.1, 89)), f.van_der_grinten(0), contract("TWvdg_c", lat0=0.0),
                 axis=size, ecc=0.0, scale=("k", "h"))
    yield robinson_row()


ROBINSON = [(1.0, 0.0), (0.9986, 0.062), (0.9954, 0.124), (0.99, 0.186), (0.9822, 0.248),
            (0.973, 0.31), (0.96, 0.372), (0.9427, 0.434), (0.9216, 0.4958), (0.8962, 0.5571),
            (0.8679, 0.6176), (0.835, 0.6769), (0.7986, 0.7346), (0.7597, 0.7903), (0.7186, 0.8435),
            (0.6732, 0.8936), (0.6213, 0.9394), (0.5722, 0.9761), (0.5322, 1.0)]


def clamped_spline(values, first, last):
    """The cubic spline through values a twelfth of 60 degrees apart, with its slopes at the ends."""
    h, n = mp.radians(5), len(values)
    size = mp.matrix(n, n)
    right = mp.matrix(n, 1)
    size[0, 0] = size[n - 1, n - 1] = 1
    right[0], right[n - 1] = first, last
    for i in range(1, n - 1):
        size[i, i - 1], size[i, i], size[i, i + 1] = 1, 4, 1
        right[i] = 3 * (values[i + 1] - values[i - 1]) / h
    slope = mp.lu_solve(size, right)

    def value(lat):
        i = min(int(mp.floor(lat / h)), n - 2)
        t = lat / h - i
        return (values[i] * (1 + 2 * t) * (1 - t) ** 2 + slope[i] * h * t * (1 - t) ** 2
                + values[i + 1] * t * t * (3 - 2 * t) + slope[i + 1] * h * t * t * (t - 1))

    return value


def robinson_reference():
    """Robinson's table, his heights 0.5072 of a map of width pi times the equator's 0.8487."""
    length = [mp.mpf(str(a)) for a, _ in ROBINSON]
    height = [mp.mpf(str(b)) for _, b in ROBINSON]
    x = clamped_spline(length, 0, mp.mpf("-0.43430550824143654"))
    y = clamped_spline(height, mp.mpf("0.062") / mp.radians(5), mp.mpf("0.24006922664096747"))
    size = mp.mpf("0.8487")
    up = mp.mpf("0.5072") * mp.pi * size
    return lambda lon, lat: (size * x(abs(lat)) * lon, up * mp.sign(lat) * y(abs(lat)))


def robinson_row():
    from pyproj import Proj
    k = {**contract("TWrobin_c", lat0=0.0), "radius": 1.0, "a": 1.0}
    row = family("Robinson", "TWrobin", "sphere, lat -89 to 89", ((-179, -89), (179, 89)),
                 robinson_reference(), k, axis=6370997.0, ecc=0.0, scale=("k", "h"), count=200,
                 against="the table and clamped splines, 50 digits",
                 parts=("TWrobin_csform", "TWrobin_cseval", "TWrobin_csderv", "TWrobin_csinv"))
    between = scatter((-170, -85), (170, 85), 400)
    peer = np.column_stack(Proj("+proj=robin +R=6370997")(*between.T))
    other = 6370997.0 * points("TWrobin_f", between * DEGREE, **{**k, "lon0": 0.0})[:, :2]
    row.note = (f"PROJ rounds the height and interpolates otherwise between the table's parallels: up "
                f"to {np.hypot(*(other - peer).T).max() / 1000:.1f} km apart")
    return row


def special():
    a = 6378388.0
    ecc = float(np.sqrt((2 - 1 / 297) / 297))
    lon0, lat0 = 173 * DEGREE, -41 * DEGREE
    k = contract("TWn_zeal_c", e=ecc, lat0=lat0)
    yield family("New Zealand map grid", "TWn_zeal", "166 to 179 E, 34 to 48 S", ((166, -48), (179, -34)),
                 f.new_zealand(mp.mpf(ecc), mp.mpf(lon0), mp.mpf(lat0)), k, lon0=lon0, axis=a, ecc=ecc,
                 scale=("k", "k"), count=300)
    yield zealand_polynomial()
    yield malaya_row()
    yield indian_row()
    yield rotated_row()
    yield chamberlin_row()
    yield from space_rows()


def zealand_polynomial():
    errors, back = [], []
    for re, im in scatter((-0.12, -0.12), (0.12, 0.12), 200):
        z = mp.mpc(float(re), float(im))
        value = sum(b * z ** (i + 1) for i, b in enumerate(f.NZMG))
        slope = sum((i + 1) * b * z ** i for i, b in enumerate(f.NZMG))
        got = contract("TWn_zeal_fpoly", re=re, im=im)["result"][:2]
        turn = contract("TWn_zeal_grad", re=re, im=im)["result"][:2]
        errors.append(float(max(abs(mp.mpc(*map(float, got)) - value),
                                abs(mp.mpc(*map(float, turn)) - slope))))
        inverse = contract("TWn_zeal_ipoly", re=float(value.real), im=float(value.imag))["result"]
        back.append(np.hypot(inverse[0] - re, inverse[1] - im))
    return Row("New Zealand's polynomial", "`TWn_zeal_fpoly`, `TWn_zeal_grad`, `TWn_zeal_ipoly`",
               "arguments to 0.12", MP, 200, Error.of(np.array(errors), ""),
               Error.of(np.array(back), ""))


def malaya_row():
    """The polynomials against the skew projection for which they stand."""
    a, inverse_f = 6377304.063, 300.8017
    ecc = float(np.sqrt((2 - 1 / inverse_f) / inverse_f))
    p = contract("TWmalaya_param")
    lon_c, lat_c, skew, k0 = (p[n][0] for n in ("lon_c", "lat_c", "skew", "k0"))
    reference = f.rectified_skew(mp.mpf(ecc), *(mp.mpf(float(v)) for v in (lon_c, lat_c, skew)))
    place = geographic((100, 1.3), (104, 6.5), 200)
    exact = a * k0 * rounded(exactly(reference, place))
    table = contract("TWmalaya_c")["table"]
    k = {"table": table, "lon0": lon_c, "lat0": lat_c}
    got = points("TWmalaya_f", place, **k)[:, :2] * a * k0
    back = points("TWmalaya_i", got + [p["false_easting"][0], p["false_northing"][0]], **k)
    row = Row("Malaya grid", "`TWmalaya_f`, `TWmalaya_i`", "100 to 104 E, 1.3 to 6.5 N",
              "the skew projection, 50 digits", 200, Error.of(np.hypot(*(got - exact).T)),
              Error.of(on_the_ground(a, place, back)),
              note="polynomials of degree five on the grid's own origin; `TWrso_f` is exact; inverse: the way back")
    row.extra.update(place=place, error=np.hypot(*(got - exact).T))
    return row


def indian_row():
    k = contract("TWind_phed_c", e=E, lat0=20 * DEGREE)
    k.update(lon0=78 * DEGREE, lat0=20 * DEGREE, a=A)
    place = geographic((76, 18), (80, 22), 200)
    reference = f.polyconic(e, mp.mpf(78 * DEGREE), mp.mpf(20 * DEGREE))
    exact = exactly(reference, place)
    got = points("TWind_phed_f", place, **k)
    row = Row("Indian polyhedric", "`TWind_phed_f`, `TWind_phed_i`", "within 2 degrees of the origin",
              "polyconic, 50 digits", 200, Error.of(A * apart(exact, got)),
              Error.of(on_the_ground(A, place, points("TWind_phed_i", got[:, :2], **k))),
              note="two orders of a series; inverse: the way back")
    row.extra.update(place=place, error=A * apart(exact, got))
    return row


def rotated_row():
    pole_lon, pole_lat = 0.3, 0.8
    k = contract("TWrotgrat_c", lon0=0.1, lat0=0.4, pole_lon=pole_lon, pole_lat=pole_lat)
    k.update(lon0=0.1, lat0=0.4, pole_lon=pole_lon, pole_lat=pole_lat)
    place = geographic((-180, -85), (180, 85), 400)
    turn = f.rotated(mp.mpf(pole_lon), mp.mpf(pole_lat))
    got = points("TWrotgrat_f", place, **k)[:, :2]
    exact = rounded(exactly(turn, place))
    # the turn of the new graticule is a convention: that which fits the first point
    exact[:, 0] += got[0, 0] - exact[0, 0]
    back = points("TWrotgrat_i", got, **k)
    return Row("Rotated graticule", "`TWrotgrat_f`, `TWrotgrat_i`", "lat -85 to 85", MP, 400,
               Error.of(on_the_ground(A, exact, got)), Error.of(on_the_ground(A, place, back)))


def chamberlin_by_definition(corners, plane):
    """Circles of the geodesic distances round the corners, and the mean of where they meet."""
    g = Geodesic(1.0, 1 / 298.257222101)

    def reference(lon, lat):
        r = [g.Inverse(c[1], c[0], lat, lon)["s12"] for c in corners]
        azimuth = [g.Inverse(c[1], c[0], lat, lon)["azi1"] for c in corners]
        met = []
        for i in range(3):
            j = (i + 1) % 3
            side = plane[j] - plane[i]
            d = np.hypot(*side)
            along = (r[i] ** 2 - r[j] ** 2 + d * d) / (2 * d)
            across = np.sqrt(max(r[i] ** 2 - along ** 2, 0))
            base = g.Inverse(corners[i][1], corners[i][0], corners[j][1], corners[j][0])["azi1"]
            left = np.sin((azimuth[i] - base) * DEGREE) < 0
            normal = np.array([-side[1], side[0]]) / d
            met.append(plane[i] + side / d * along + normal * across * (1 if left else -1))
        return np.mean(met, axis=0)

    return reference


def chamberlin_row():
    corners = np.array([[-20.0, 30.0], [20.0, 30.0], [0.0, 60.0]])
    control = np.column_stack([corners * DEGREE, np.zeros(3)])
    k = contract("TWchamtri_c", forward=0, mode=1, e=E, control=control, plane=np.zeros((3, 3)),
                 sides=np.zeros(3), azimuths=np.zeros(3), lon_c=np.array([0.0]),
                 lat_c=np.array([40 * DEGREE]), rotation=np.array([np.pi / 2]))
    k["e"] = E
    reference = chamberlin_by_definition(corners, k["plane"][:, :2])
    degrees = scatter((-15, 32), (15, 50), 150)
    exact = np.array([reference(*p) for p in degrees])
    got = points("TWchamtri_f", degrees * DEGREE, **k)[:, :2]
    return Row("Chamberlin trimetric", "`TWchamtri_f`", "a triangle of 40 by 30 degrees",
               "its definition on GeographicLib", 150, Error.of(A * np.hypot(*(got - exact).T)),
               note="inverse by `TWgeneric_i`")


SATELLITES = {2: (99.092, 18, 251, 128.87), 5: (98.2, 16, 233, 129.3056)}
CLARKE_A = 6378206.4
CLARKE_E = float(np.sqrt(1 - (6356583.8 / CLARKE_A) ** 2))


def orbit_of(satellite, path):
    """Both planes of a path of Landsat; e, inclination, ratio of the periods and node as doubles."""
    inclination, days, paths, first = SATELLITES[satellite]
    node = np.remainder((first - 360 / paths * path) * DEGREE + np.pi, 2 * np.pi) - np.pi
    given = (CLARKE_E, inclination * DEGREE, days / paths, node)
    numbers = [mp.mpf(float(v)) for v in given]
    return f.RolledTrack(*numbers), f.SpaceOblique(*numbers), given


def scanned_strip(given, angles, width=0.0145):
    """Longitude, latitude on the track and 92 km to its sides, and the angles along the orbit."""
    ecc, inclination, ratio, node = given
    where, along = [], []
    for angle in angles:
        ground = np.arcsin(np.sin(inclination) * np.sin(angle))
        lat = np.arctan(np.tan(ground) / (1 - ecc ** 2))
        turned = np.arctan2(np.cos(inclination) * np.sin(angle), np.cos(angle))
        turned += 2 * np.pi * np.round((angle - turned) / (2 * np.pi))
        east = np.cos(inclination) / np.cos(ground) ** 2 - ratio
        north = np.sin(inclination) * np.cos(angle) / np.cos(ground)
        way = np.arctan2(east * np.cos(lat), north)
        for side in (-width, 0, width):
            where.append((turned - ratio * angle + node + side * np.cos(way) / np.cos(lat),
                          lat - side * np.sin(way)))
            along.append(angle)
    where = np.array(where)
    where[:, 0] = np.remainder(where[:, 0] + np.pi, 2 * np.pi) - np.pi
    return where, along


def on_plane(plane, place, along):
    return [plane.forward(mp.mpf(float(p[0])), mp.mpf(float(p[1])), mp.mpf(float(angle)))
            for p, angle in zip(place, along)]


def without_turn(one, other):
    """Distances of two planes in doubles that are left when one is turned and moved onto the other."""
    one, other = one @ [1, 1j], other @ [1, 1j]
    one, other = one - one.mean(), other - other.mean()
    turn = np.vdot(other, one)
    return np.abs(one - other * turn / abs(turn))


def space_rows():
    from pyproj import Proj
    for satellite, terms, grid in ((2, 5, 65), (5, 5, 65), (5, 20, 513)):
        path = 15
        rolled, closed, given = orbit_of(satellite, path)
        constants = dict(zip(("e", "inc", "P"), given), eps=0.0, om=0.0, n_terms=terms, n_points=grid)
        k = {**contract("TWsom_c", **constants), **constants, "axes": 1, "orbit": 0, "side": 1,
             "lon_n": given[3]}
        place, along = scanned_strip(given, np.linspace(1.7, 3.08, 40))
        exact = on_plane(rolled, place, along)
        error = CLARKE_A * apart(exact, points("TWsom_f", place, **k))
        back = points("TWsom_i", rounded(exact), **k)
        row = Row(f"Space oblique Mercator, Landsat {satellite}, {terms} terms", "`TWsom_f`, `TWsom_i`",
                  "the scanned strip from its northernmost point to the equator",
                  "the track rolled out by its curvature, 50 digits", len(place), Error.of(error),
                  Error.of(on_the_ground(CLARKE_A, place, back)))
        snyder = CLARKE_A * rounded(on_plane(closed, place, along))
        turned = without_turn(CLARKE_A * rounded(exact), snyder)
        if terms == 5:
            peer = Proj(f"+proj=lsat +lsat={satellite} +path={path} +ellps=clrk66")
            # PROJ counts the second system's node from 129.30 degrees
            node = 0 if satellite == 2 else 129.3056 - 129.30
            other = np.column_stack(peer((place[:, 0] / DEGREE) - node, place[:, 1] / DEGREE))
            off = np.hypot(*(other - snyder).T).max()
            far = np.hypot(*(CLARKE_A * rounded(exact) - snyder).T).max()
            row.note = (f"Snyder's closed form for circular orbits, which PROJ has (to {1000 * off:.0f} "
                        f"mm), lies {far:.0f} m from it, {turned.max():.0f} m without turn and shift")
        else:
            row.note = f"{grid} points of the orbit instead of 65"
        row.extra.update(along=np.array(along), error=error, turned=turned)
        yield row
