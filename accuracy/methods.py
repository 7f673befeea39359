"""Every method of projection of the systems layer."""

import mpmath as mp
import numpy as np
from geographiclib.geodesic import Geodesic

import formulas as f
from library import Projection, contract, methods
from measure import (A, DEGREE, E, INVERSE_F, MP, Error, Row, apart, e, in_turn, on_the_ground,
                     relative, rounded, scatter)
from projections import (CLARKE_A, CLARKE_E, chamberlin_by_definition, exact_cassini, on_plane, orbit_of, robinson_reference,
                         scanned_strip)

SPHERE = 6370997.0
BALL = f" a={SPHERE:.0f}"
GRS = " ellps=GRS80"
WORLD = ((-179, -89), (179, 89))


def flattened(inverse_flattening):
    return float(np.sqrt((2 - 1 / inverse_flattening) / inverse_flattening))


def rad(*degrees):
    return [mp.radians(mp.mpf(str(d))) for d in degrees]


def scaled(k, reference):
    return lambda lon, lat: [k * v for v in reference(lon, lat)]


def from_point(reference, lon, lat):
    """The same, counted from where a point comes to lie."""
    x0, y0 = reference(lon, lat)
    return lambda *p: [v - w for v, w in zip(reference(*p), (x0, y0))]


def exact_row(definition, domain, box, reference, axis=A, ecc=E, count=200, scale=True, note="",
              parameters=None, tail="", against=MP):
    """Forward, inverse and factors of a projection against a formula in units of the axis."""
    if parameters is None:
        map_ = Projection(definition)
    else:
        rf = 0.0 if ecc == 0 else 1 / (1 - np.sqrt(1 - ecc * ecc))
        map_ = Projection(definition, parameters, axis, rf)
    degrees = scatter(*box, count)
    # the library turns degrees into radians itself
    numbers = [(mp.radians(mp.mpf(float(p[0]))), mp.radians(mp.mpf(float(p[1])))) for p in degrees]
    exact = [[v * mp.mpf(axis) for v in reference(*p)] for p in numbers]
    got = map_.forward(degrees)
    back = map_.inverse(rounded(exact))
    row = Row(map_.method + tail, "`Projection`", domain, against, count, Error.of(apart(exact, got)),
              Error.of(on_the_ground(axis, degrees * DEGREE, back * DEGREE)), note=note)
    if scale:
        some = range(0, count, 4)
        truth = [f.distortion(mp.mpf(ecc), reference, *numbers[i]) for i in some]
        factors = map_.factors(degrees)[::4]
        row.scale = Error.of(np.maximum(relative([t["h"] for t in truth], factors[:, 0]),
                                        relative([t["k"] for t in truth], factors[:, 1])), "")
    row.extra.update(place=degrees * DEGREE, error=apart(exact, got), method=map_.method)
    return row


def geodesic_row(definition, domain, box, reference, note="", tail=""):
    degrees = scatter(*box, 300)
    exact = np.array([reference(*p) for p in degrees])
    map_ = Projection(definition)
    got = map_.forward(degrees)
    error = np.hypot(*(got - exact).T)
    row = Row(map_.method + tail, "`Projection`", domain, "GeographicLib", 300, Error.of(error),
              Error.of(on_the_ground(A, degrees * DEGREE, map_.inverse(exact) * DEGREE)), note=note)
    row.extra.update(place=degrees * DEGREE, error=error, method=map_.method)
    return row


def rows():
    """A row at least for each method; the names of those without one are an error."""
    found = []
    for row in in_turn(conformal, equal_area, others, perspectives, orbits):
        found.append(row)
        yield row
    missing = set(methods()) - {row.extra["method"] for row in found}
    if missing:
        raise SystemExit("no row: " + ", ".join(sorted(missing)))
    own = [row for row in found if "50 digits" in row.against and "define it" not in row.note]
    worst = np.array([row.forward.worst for row in own])
    back = np.array([row.inverse.worst for row in own])
    yield Row(f"The {len({row.extra['method'] for row in own})} methods of projection with a formula or "
              "series of their own", "`Projection`, `Projection::forward`, `Projection::inverse`", "the domains of their rows", MP,
              sum(row.count for row in own), Error.of(worst), Error.of(back),
              note="in brackets what 95 of 100 methods stay below")


def conformal():
    return in_turn(mercators, lamberts, oblique_mercators, krovaks, stereographics)


def mercators():
    near, wide = ((-3, -84), (3, 84)), ((-35, -84), (35, 84))
    tm = f.transverse_mercator(e, 0, 0)
    words = "transverse mercator lat0=0 lon0=0 k0=1" + GRS
    yield exact_row(words, "lon within 3, lat -84 to 84", near, tm, count=120, tail=", 3 degrees")
    yield exact_row(words, "lon within 35, lat -84 to 84", wide, tm, scale=False, tail=", 35 degrees",
                    note="refuses beyond 3,900 km from the central meridian")
    words = words.replace("transverse mercator", "transverse mercator 3d")
    yield exact_row(words, "lon within 3, lat -84 to 84", near, tm, count=60)
    words = words.replace(" 3d", " south")
    yield exact_row(words, "lon within 3, lat -84 to 84", near, scaled(-1, tm), count=60)

    def zoned(lon, lat):
        zone = int(mp.floor((lon + mp.pi) / mp.radians(6))) + 1
        x, y = f.transverse_mercator(e, mp.radians(6 * zone - 183), 0)(lon, lat)
        k = mp.mpf("0.9996")
        return k * x + mp.mpf(zone * 1000000 + 500000) / A, k * y

    yield exact_row("Transverse Mercator Zoned Grid System", "30 W to 30 E, lat -84 to 84",
                    ((-30, -84), (30, 84)), zoned, count=100, scale=False, parameters={
                        "Initial longitude": -180.0, "Zone width": 6.0,
                        "Scale factor at natural origin": 0.9996, "False easting": 500000.0})
    merc = f.mercator(e, 0, 0)
    yield exact_row("mercator 1sp lat0=0 lon0=0 k0=0.99" + GRS, "lat -89 to 89", WORLD,
                    scaled(mp.mpf("0.99"), merc))
    k = f.parallel(e, *rad(40))
    yield exact_row("mercator lat1=40 lon0=0" + GRS, "lat -89 to 89", WORLD, scaled(k, merc))
    yield exact_row("Mercator (variant C)", "lat -89 to 89", WORLD,
                    from_point(scaled(k, merc), 0, *rad(30)), parameters={
                        "Latitude of 1st standard parallel": 40.0, "Latitude of false origin": 30.0})
    yield exact_row("pseudo mercator lat0=0 lon0=0" + GRS, "lat -89 to 89", WORLD,
                    f.mercator(0, 0, 0))


def lamberts():
    cone = rad(46.5, 44, 49)
    words = " lat0=46.5 lon0=0 lat1=44 lat2=49" + GRS
    fan, domain = ((-179, -60), (179, 89)), "lat -60 to 89"
    two = f.lambert_conformal(e, 0, *cone)
    yield exact_row("lambert conformal" + words, domain, fan, two)
    one = f.lambert_conformal(e, 0, *rad(46.5, 46.5, 46.5))
    k = mp.mpf("0.99987742")
    tangent = " lat0=46.5 lon0=0 k0=0.99987742" + GRS
    yield exact_row("lambert conformal 1sp" + tangent, domain, fan, scaled(k, one))
    yield exact_row("lambert conformal west" + tangent, domain, fan,
                    lambda lon, lat: [v * s for v, s in zip(scaled(k, one)(lon, lat), (-1, 1))])
    yield exact_row("Lambert Conic Conformal (1SP variant B)", domain, fan,
                    from_point(scaled(k, one), 0, *rad(40)), parameters={
                        "Latitude of natural origin": 46.5, "Scale factor at natural origin": 0.99987742,
                        "Latitude of false origin": 40.0})
    yield exact_row("Lambert Conic Conformal (2SP Michigan)", domain, fan,
                    scaled(mp.mpf("1.0000382"), two), parameters={
                        "Latitude of false origin": 46.5, "Latitude of 1st standard parallel": 44.0,
                        "Latitude of 2nd standard parallel": 49.0, "Ellipsoid scaling factor": 1.0000382})
    n, radius = belgian_cone(cone)
    turn = mp.radians(mp.mpf("29.2985") / 3600)
    yield exact_row("lambert conformal belgium" + words, domain, fan,
                    lambda lon, lat: (radius(lat) * mp.sin(n * lon - turn),
                                      radius(cone[0]) - radius(lat) * mp.cos(n * lon - turn)))
    yield exact_row("lambert near conformal lat0=34.65 lon0=37.35 k0=0.9996256" + GRS,
                    "Syria and Lebanon", ((34, 31), (41, 38)),
                    f.near_conformal(e, *rad(37.35, 34.65), mp.mpf("0.9996256")))


def belgian_cone(cone):
    lat1, lat2 = cone[1:]
    n = (mp.log(f.parallel(e, lat1) / f.parallel(e, lat2))
         / (f.isometric(e, lat2) - f.isometric(e, lat1)))
    size = f.parallel(e, lat1) / n * mp.exp(n * f.isometric(e, lat1))
    return n, lambda lat: size * mp.exp(-n * f.isometric(e, lat))


def oblique_mercators():
    centre, box, domain = rad(115, 4, 53.3), ((105, -6), (125, 14)), "lon within 10, lat -6 to 14"
    skew = f.hotine(e, *centre, rectified=rad(53.13)[0])
    words = " lat0=4 lon0=115 azimuth=53.3 gamma=53.13 k0=1" + GRS
    yield exact_row("oblique mercator variant a" + words, domain, box, skew)
    yield exact_row("oblique mercator" + words, domain, box, from_point(skew, *centre[:2]))
    yield exact_row("two point oblique mercator lat0=4 lat1=1 lon1=110 lat2=7 lon2=120 k0=1" + GRS,
                    domain, box, f.two_point(e, *rad(4, 1, 110, 7, 120)))
    yield exact_row("rectified skew orthomorphic lat0=4 lon0=115 azimuth=-36.87 k0=1" + GRS, domain, box,
                    f.rectified_skew(e, *rad(115, 4, -36.87)))
    yield exact_row("somerc lat0=46.95 lon0=7.44 k0=1 ellps=bessel", "Switzerland",
                    ((5.9, 45.8), (10.5, 47.8)), f.swiss(mp.mpf(flattened(299.1528128)), *rad(7.44, 46.95)),
                    axis=6377397.155, ecc=flattened(299.1528128))
    ecc, axis = flattened(297), 6378388.0
    k = f.gauss_sphere(mp.mpf(ecc), *rad("-18.9"))[2] * mp.mpf("0.9995")
    yield exact_row("laborde lat0=-18.9 lon0=46 azimuth=18.9 k0=0.9995 ellps=intl",
                    "lon within 4, lat -27 to -11", ((42, -27), (50, -11)),
                    scaled(k, f.laborde(mp.mpf(ecc), rad(46)[0], *rad("-18.9", "18.9"))), axis=axis,
                    ecc=ecc)
    yield exact_row("new zealand map grid lat0=-41 lon0=173 ellps=intl", "166 to 179 E, 34 to 48 S",
                    ((166, -48), (179, -34)), f.new_zealand(mp.mpf(ecc), *rad(173, -41)), axis=axis,
                    ecc=ecc)
    p = contract("TWmalaya_param")
    lon_c, lat_c, turn, k0, x0 = (float(p[n][0]) for n in ("lon_c", "lat_c", "skew", "k0",
                                                           "false_easting"))
    axis, ecc = 6377304.063, flattened(300.8017)
    skew = f.rectified_skew(mp.mpf(ecc), *(mp.mpf(v) for v in (lon_c, lat_c, turn)))

    def malaya(lon, lat):
        x, y = scaled(mp.mpf(k0), skew)(lon, lat)
        return x + mp.mpf(x0) / axis, y

    yield exact_row("Malaya Grid", "100 to 104 E, 1.3 to 6.5 N", ((100, 1.3), (104, 6.5)),
                    malaya, axis=axis, ecc=ecc, against="the skew projection, 50 digits", scale=False,
                    note="polynomials of degree five define it", parameters={})


def krovaks():
    axis, ecc = 6377397.155, flattened(299.1528128)
    plane, modified = f.krovak(mp.mpf(ecc)), f.modified_krovak(mp.mpf(ecc), axis)
    x0 = mp.mpf(5000000) / axis

    def shifted(lon, lat):
        return [v - x0 for v in modified(lon, lat)]

    for name, reference in (
            ("Krovak (North Orientated)", plane), ("Krovak Modified (North Orientated)", shifted),
            ("Krovak", scaled(-1, plane)),
            ("Krovak Modified", scaled(-1, shifted))):
        false = {"False easting": 5e6, "False northing": 5e6} if "Modified" in name else {}
        yield exact_row(name, "12 to 23 E, 47 to 51 N", ((12, 47), (23, 51)), reference, axis=axis, ecc=ecc,
                        parameters={"Latitude of projection centre": 49.5,
                                    "Longitude of origin": 24 + 50 / 60,
                                    "Co-latitude of cone axis": 30 + 17 / 60 + 17.30311 / 3600,
                                    "Latitude of pseudo standard parallel": 78.5,
                                    "Scale factor on pseudo standard parallel": 0.9999, **false})
    yield exact_row("bipolar conic" + BALL, "the Americas", ((-108, -15), (-50, 60)),
                    f.bipolar(scaled=True), axis=SPHERE, ecc=0.0)
    lon0, lat0, d1, d2 = rad(0, 45, -3, 4)
    given = contract("TWo_lam_c", e=E, lon0=0.0, lat0=float(lat0), d1=float(d1), d2=float(d2),
                     azimuth=float(rad(30)[0]), use_azimuth=1)
    pole = [mp.mpf(float(given[n][0])) for n in ("pole_lon", "pole_lat")]
    radius = mp.sqrt(f.nu(e, lat0 + (d1 + d2) / 2) * f.rho(e, lat0 + (d1 + d2) / 2))
    yield exact_row("oblique lambert lat0=45 lon0=0 lat1=-3 lat2=4 azimuth=30 k0=1" + GRS,
                    "lon within 12, lat 35 to 55", ((-12, 35), (12, 55)),
                    scaled(radius, f.oblique_lambert(e, lon0, lat0, d1, d2, *pole)))


def stereographics():
    near, domain = ((-30, 20), (30, 75)), "lon within 30, lat 20 to 75"
    yield exact_row("stereographic lat0=50 lon0=0" + GRS, domain, near, f.stereographic(e, 0, *rad(50)))
    _, _, radius, _, _ = f.gauss_sphere(e, *rad(50))
    yield exact_row("oblique stereographic lat0=50 lon0=0 k0=1" + GRS, domain, near,
                    scaled(radius, f.double_stereographic(e, 0, *rad(50))))
    polar = f.stereographic(e, 0, mp.pi / 2)
    box, domain = ((-179, 0), (179, 89.9)), "lat 0 to 89.9"
    yield exact_row("polar stereographic variant a lat0=90 lon0=0 k0=1" + GRS, domain, box, polar)
    lat1 = rad(71)[0]
    size = f.parallel(e, lat1) / -polar(0, lat1)[1]
    for letter, reference in (("B", scaled(size, polar)), ("C", from_point(scaled(size, polar), 0, lat1))):
        yield exact_row(f"Polar Stereographic (variant {letter})", domain, box, reference,
                        parameters={"Latitude of standard parallel": 71.0})


def equal_area():
    fan = ((-179, -60), (179, 89))
    yield exact_row("albers lat0=46.5 lon0=0 lat1=44 lat2=49" + GRS, "lat -60 to 89", fan,
                    f.albers(e, 0, *rad(46.5, 44, 49)))
    box, domain = ((-90, -30), (90, 89)), "lon within 90, lat -30 to 89"
    yield exact_row("azimuthal equal area lat0=50 lon0=0" + GRS, domain, box,
                    f.azimuthal_equal_area(e, 0, *rad(50)))
    radius = mp.sqrt(f.authalic(e, mp.pi / 2) / 2)
    yield exact_row("azimuthal equal area spherical lat0=50 lon0=0" + GRS, domain, box,
                    scaled(radius, f.azimuthal_equal_area(0, 0, *rad(50))),
                    note="of the sphere of equal area")
    yield exact_row("cylindrical equal area lat1=40 lon0=0" + GRS, "lat -89 to 89", WORLD,
                    f.cylindrical_equal_area(e, 0, *rad(40)))
    yield exact_row("cylindrical equal area spherical lat1=40 lon0=0" + GRS, "lat -89 to 89", WORLD,
                    f.cylindrical_equal_area(0, 0, *rad(40)))
    yield exact_row("equal earth lon0=0" + GRS, "lat -89 to 89", WORLD, f.equal_earth(e, 0))
    bonne, box = f.bonne(e, 0, *rad(45)), ((-60, -60), (60, 85))
    yield exact_row("bonne lat0=45 lon0=0" + GRS, "lon within 60, lat -60 to 85", box, bonne)
    yield exact_row("bonne south lat0=45 lon0=0" + GRS, "lon within 60, lat -60 to 85", box,
                    scaled(-1, bonne))
    yield exact_row("sinusoidal lon0=0" + GRS, "lat -89 to 89", WORLD, f.sinusoidal(e, 0))
    for word, reference in (("mollweide", f.mollweide(0)), ("eckert iv", f.eckert4(0))):
        yield exact_row(f"{word} lon0=0" + BALL, "sphere, lat -89 to 89", WORLD, reference, axis=SPHERE,
                        ecc=0.0)


def others():
    yield from series()
    yield exact_row("equidistant conic lat0=46.5 lon0=0 lat1=44 lat2=49" + GRS, "lat -60 to 89",
                    ((-179, -60), (179, 89)), f.equidistant_conic(e, 0, *rad(46.5, 44, 49)))
    yield exact_row("polyconic lat0=10 lon0=0" + GRS, "lon within 30, lat -80 to 80",
                    ((-30, -80), (30, 80)), f.polyconic(e, 0, *rad(10)))
    yield exact_row("imw polyconic lat1=40 lon0=0" + GRS, "a sheet, lat 40 to 44, lon within 3",
                    ((-3, 40), (3, 44)), f.imw(e, 0, *rad(40)))
    yield exact_row("equidistant cylindrical lat0=0 lon0=0 lat1=40" + GRS, "lat -89 to 89", WORLD,
                    f.equirectangular(e, 0, 0, *rad(40)))
    yield exact_row("equidistant cylindrical spherical lat0=0 lon0=0 lat1=40" + GRS, "lat -89 to 89",
                    WORLD, f.equirectangular(0, 0, 0, *rad(40)))
    g = Geodesic(A, 1 / INVERSE_F)

    def equidistant(lon, lat):
        line = g.Inverse(50, 0, lat, lon)
        return (line["s12"] * np.sin(line["azi1"] * DEGREE),
                line["s12"] * np.cos(line["azi1"] * DEGREE))

    for reach, box in ((2000, ((-25, 34), (25, 65))), (18000, ((-170, -45), (170, 89)))):
        yield geodesic_row("azimuthal equidistant lat0=50 lon0=0" + GRS, f"to {reach:,} km", box,
                           equidistant, tail=f", {reach} km")
    yield exact_row("robinson lon0=0" + BALL, "sphere, lat -89 to 89", WORLD, robinson_reference(),
                    axis=SPHERE, ecc=0.0, against="the table and clamped splines, 50 digits",
                    note="PROJ interpolates otherwise between the table's parallels")
    yield exact_row("miller lon0=0" + BALL, "sphere, lat -89 to 89", WORLD, f.miller(0, 0), axis=SPHERE,
                    ecc=0.0)
    yield exact_row("van der grinten lon0=0" + BALL, "sphere, a quadrant", ((-179, 0.5), (-0.5, 89)),
                    f.van_der_grinten(0), axis=SPHERE, ecc=0.0)
    yield chamberlin()


def series():
    """Methods that the registry defines by a series, and what the series stands for."""
    box, domain = ((-6, -80), (6, 80)), "lon within 6, lat -80 to 80"
    own = "the registry's series, 50 digits"
    yield exact_row("cassini lat0=0 lon0=0" + GRS, domain, box, f.cassini_series(e, 0, 0), against=own)
    yield geodesic_row("cassini lat0=0 lon0=0" + GRS, domain, box,
                       lambda lon, lat: exact_cassini(A, 1 / INVERSE_F, lon, lat),
                       "the registry's method is the series itself", tail=", beside Cassini's own")
    yield exact_row("hyperbolic cassini lat0=-16.25 lon0=179.33333333333334 ellps=GRS80", "Vanua Levu",
                    ((178, -17), (180, -15.8)),
                    f.cassini_series(e, rad("179.33333333333334")[0], rad("-16.25")[0], hyperbolic=True),
                    against=own)
    yield exact_row("modified azimuthal equidistant lat0=9.5 lon0=138" + GRS, "Yap, within 100 km",
                    ((137.2, 8.8), (138.9, 10.3)), f.modified_equidistant(e, *rad(138, 9.5)), against=own)
    yield exact_row("guam lat0=13.5 lon0=144.75" + GRS, "Guam", ((144.5, 13.2), (145, 13.7)),
                    f.guam(e, *rad(144.75, 13.5)), against=own)
    yield exact_row("colombia urban lat0=4.68 lon0=-74.15 h0=2550" + GRS, "within 50 km",
                    ((-74.6, 4.2), (-73.7, 5.1)),
                    f.colombia_urban(e, *rad(-74.15, 4.68), mp.mpf(2550) / A), against=own)
    grad = mp.pi / 200

    def tunisia(lon, lat):
        lat0, lon0 = mp.mpf("36.5964"), mp.mpf("7.83445")
        north = mp.mpf("0.010015") if lat / grad > lat0 else mp.mpf("0.01002")
        return [v * 1000 / (A * k) for v, k in ((lon / grad - lon0, mp.mpf("0.012185")),
                                                (lat / grad - lat0, north))]

    yield exact_row("Tunisia Mining Grid", "Tunisia", ((7.5, 30), (11.5, 37.5)), tunisia, against=own,
                    scale=False, parameters={"Latitude of false origin": 36.5964 * 0.9,
                                             "Longitude of false origin": 7.83445 * 0.9})
    yield exact_row("indian polyhedric lat0=20 lon0=78" + GRS, "within 2 degrees of the origin",
                    ((76, 18), (80, 22)), f.polyconic(e, *rad(78, 20)), scale=False,
                    against="polyconic, 50 digits", note="two orders of a series define it")


def chamberlin():
    map_ = Projection("chamberlin lat1=30 lon1=-20 lat2=30 lon2=20 lat3=60 lon3=0" + GRS)
    corners = np.array([[-20.0, 30.0], [20.0, 30.0], [0.0, 60.0]])
    reference = chamberlin_by_definition(corners, map_.forward(corners) / A)
    degrees = scatter((-15, 32), (15, 50), 200)
    exact = A * np.array([reference(*p) for p in degrees])
    error = np.hypot(*(map_.forward(degrees) - exact).T)
    row = Row(map_.method, "`Projection`", "a triangle of 40 by 30 degrees",
              "its definition on GeographicLib", 200, Error.of(error),
              Error.of(on_the_ground(A, degrees * DEGREE, map_.inverse(exact) * DEGREE)))
    row.extra.update(place=degrees * DEGREE, error=error, method=map_.method)
    return row


def perspectives():
    near, domain = ((-60, 0), (60, 85)), "lon within 60, lat 0 to 85"
    ortho = f.orthographic(e, 0, *rad(50))
    yield exact_row("orthographic lat0=50 lon0=0" + GRS, domain, near, ortho)
    turn, k = rad(20)[0], mp.mpf("1.00001")

    def local(lon, lat):
        x, y = ortho(lon, lat)
        return (k * (x * mp.cos(turn) - y * mp.sin(turn)), k * (x * mp.sin(turn) + y * mp.cos(turn)))

    yield exact_row("local orthographic lat0=50 lon0=0 azimuth=20 k0=1.00001" + GRS,
                    "lon within 3, lat 48 to 52", ((-3, 48), (3, 52)), local)
    yield exact_row("gnomonic lat0=50 lon0=0" + BALL, domain, near, f.gnomonic(0, *rad(50)), axis=SPHERE,
                    ecc=0.0)
    yield exact_row("vertical perspective lat0=50 lon0=0 h0=0 h=5000000" + GRS,
                    "lon within 40, lat 15 to 80", ((-40, 15), (40, 80)),
                    f.perspective(e, 0, rad(50)[0], mp.mpf(5000000) / A))
    yield exact_row("tilted perspective lat0=50 lon0=0 h=5000000 azimuth=30 tilt=20" + BALL,
                    "sphere, lon within 20, lat 35 to 65", ((-20, 35), (20, 65)),
                    f.tilted_perspective(0, rad(50)[0], mp.mpf(5000000) / SPHERE, *rad(20, 30)),
                    axis=SPHERE, ecc=0.0)


def orbits():
    for satellite in (2, 5):
        rolled, _, given = orbit_of(satellite, 15)
        angles = np.linspace(1.7, 2 * np.pi + 1.5, 60)
        place, along = scanned_strip(given, angles)
        along = np.array(along)
        exact = [[CLARKE_A * v for v in row] for row in on_plane(rolled, place, along)]
        landsat = Projection(f"landsat satellite={satellite} path=15 ellps=clrk66")
        general = Projection("Space Oblique Mercator",
                             {"Inclination of orbit": given[1] / DEGREE, "Period of revolution": given[2],
                              "Longitude of ascending node": given[3] / DEGREE}, CLARKE_A,
                             1 / (1 - np.sqrt(1 - CLARKE_E ** 2)))
        # a map of one orbit from its node on: what lies behind its end is out
        ends = {landsat: 8, general: 2 * np.pi - 0.05}
        for map_ in (landsat, general):
            own = np.flatnonzero(along < ends[map_])
            there, truth = place[own] / DEGREE, [exact[i] for i in own]
            back = map_.inverse(rounded(truth))
            error = apart(truth, map_.forward(there))
            row = Row(f"{map_.method}, satellite {satellite}", "`Projection`",
                      "92 km to both sides of the track", "the track rolled out by its curvature, "
                      "50 digits", len(own), Error.of(error),
                      Error.of(on_the_ground(CLARKE_A, there * DEGREE, back * DEGREE)))
            row.extra.update(along=along[own], error=error, method=map_.method)
            yield row
