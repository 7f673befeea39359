"""The objects of the systems layer."""

import mpmath as mp
import numpy as np
from geographiclib.geodesic import Geodesic

import formulas as f
from geodesy import geodesic_inverse, lines_strewn, rhumb_truth
from library import (Lines, Projection, Transformation, magnetic_field, mgrs_of, parse_angle,
                     position_of_mgrs)
from measure import (A, DEGREE, E, INVERSE_F, Error, Row, apart, distortions, exactly, on_the_ground,
                     relative, rounded, scatter)
from projections import exact_cassini

MP = "formula, 50 digits"
e = mp.mpf(E)
FLAT = 1 / INVERSE_F
SPHERE = 6370997.0
GRS = " ellps=GRS80"
BALL = f" a={SPHERE:.0f}"


def rows():
    yield from projections()
    yield from lines()
    yield from others()


def rad(*degrees):
    return [mp.radians(mp.mpf(str(d))) for d in degrees]


def exact_row(name, definition, domain, box, reference, axis=A, ecc=E, count=200, scale=True,
              note=""):
    """Forward, inverse and factors of a projection against a formula in units of the axis."""
    map_ = Projection(definition)
    degrees = scatter(*box, count)
    # the library turns degrees into radians itself
    numbers = [(mp.radians(mp.mpf(float(p[0]))), mp.radians(mp.mpf(float(p[1])))) for p in degrees]
    exact = [[v * mp.mpf(axis) for v in reference(*p)] for p in numbers]
    got = map_.forward(degrees)
    back = map_.inverse(rounded(exact))
    row = Row(name, "`Projection`", domain, MP, count, Error.of(apart(exact, got)),
              Error.of(on_the_ground(axis, degrees * DEGREE, back * DEGREE)), note=note)
    if scale:
        some = range(0, count, 4)
        truth = [f.distortion(mp.mpf(ecc), reference, *numbers[i]) for i in some]
        factors = map_.factors(degrees)[::4]
        row.scale = Error.of(np.maximum(relative([t["h"] for t in truth], factors[:, 0]),
                                        relative([t["k"] for t in truth], factors[:, 1])), "")
    row.extra.update(place=degrees * DEGREE, error=apart(exact, got))
    return row


def peer_row(name, definition, domain, box, peer, axis=A, count=200, note=""):
    """Against PROJ, where its algorithm is as good."""
    from pyproj import Proj
    map_ = Projection(definition)
    degrees = scatter(*box, count)
    exact = np.column_stack(Proj(peer)(*degrees.T))
    got = map_.forward(degrees)
    back = map_.inverse(got)
    return Row(name, "`Projection`", domain, "PROJ", count,
               Error.of(np.hypot(*(got - exact).T)),
               Error.of(on_the_ground(axis, degrees * DEGREE, back * DEGREE)),
               note=note or "inverse: the way back")


def geodesic_row(name, definition, domain, box, reference, note=""):
    degrees = scatter(*box, 300)
    exact = np.array([reference(*p) for p in degrees])
    map_ = Projection(definition)
    got = map_.forward(degrees)
    error = np.hypot(*(got - exact).T)
    row = Row(name, "`Projection`", domain, "GeographicLib", 300, Error.of(error),
              Error.of(on_the_ground(A, degrees * DEGREE, map_.inverse(exact) * DEGREE)), note=note)
    row.extra.update(place=degrees * DEGREE, error=error)
    return row


def projections():
    world = ((-179, -89), (179, 89))
    near = ((-30, 20), (30, 75))
    yield exact_row("Mercator", "mercator lat1=0 lon0=0" + GRS, "lat -89 to 89", world,
                    f.mercator(e, 0, 0))
    yield exact_row("Transverse Mercator, 3 degrees", "transverse mercator lat0=0 lon0=0 k0=1" + GRS,
                    "lon within 3, lat -84 to 84", ((-3, -84), (3, 84)),
                    f.transverse_mercator(e, 0, 0), count=120)
    yield exact_row("Transverse Mercator, 35 degrees", "transverse mercator lat0=0 lon0=0 k0=1" + GRS,
                    "lon within 35, lat -84 to 84", ((-35, -84), (35, 84)),
                    f.transverse_mercator(e, 0, 0), count=200, scale=False,
                    note="refuses beyond 3,900 km from the central meridian")
    cone = rad(46.5, 44, 49)
    words = " lat0=46.5 lon0=0 lat1=44 lat2=49" + GRS
    fan = ((-179, -60), (179, 89))
    yield exact_row("Lambert conformal conic", "lambert conformal" + words, "lat -60 to 89", fan,
                    f.lambert_conformal(e, 0, *cone))
    yield exact_row("Albers", "albers" + words, "lat -60 to 89", fan, f.albers(e, 0, *cone))
    yield exact_row("Equidistant conic", "equidistant conic" + words, "lat -60 to 89", fan,
                    f.equidistant_conic(e, 0, *cone))
    yield exact_row("American polyconic", "polyconic lat0=10 lon0=0" + GRS, "lon within 30",
                    ((-30, -80), (30, 80)), f.polyconic(e, 0, *rad(10)))
    yield exact_row("Bonne", "bonne lat0=45 lon0=0" + GRS, "lon within 60, lat -60 to 85",
                    ((-60, -60), (60, 85)), f.bonne(e, 0, *rad(45)))
    yield exact_row("Equidistant cylindrical", "equidistant cylindrical lat0=0 lon0=0 lat1=40" + GRS,
                    "lat -89 to 89", world, f.equirectangular(e, 0, 0, *rad(40)))
    yield exact_row("Cylindrical equal-area", "cylindrical equal area lat1=40 lon0=0" + GRS,
                    "lat -89 to 89", world, f.cylindrical_equal_area(e, 0, *rad(40)))
    yield exact_row("Stereographic, oblique", "stereographic lat0=50 lon0=0" + GRS,
                    "lon within 30, lat 20 to 75", near, f.stereographic(e, 0, *rad(50)))
    yield exact_row("Polar stereographic", "polar stereographic variant a lat0=90 lon0=0 k0=1" + GRS,
                    "lat 0 to 89.9", ((-179, 0), (179, 89.9)), f.stereographic(e, 0, mp.pi / 2))
    _, _, radius, _, _ = f.gauss_sphere(e, *rad(50))
    double = f.double_stereographic(e, 0, *rad(50))
    yield exact_row("Oblique (double) stereographic", "oblique stereographic lat0=50 lon0=0 k0=1" + GRS,
                    "lon within 30, lat 20 to 75", near,
                    lambda lon, lat: [radius * v for v in double(lon, lat)])
    yield exact_row("Lambert azimuthal equal-area", "azimuthal equal area lat0=50 lon0=0" + GRS,
                    "lon within 90, lat -30 to 89", ((-90, -30), (90, 89)),
                    f.azimuthal_equal_area(e, 0, *rad(50)))
    g = Geodesic(A, FLAT)

    def equidistant(lon, lat):
        line = g.Inverse(50, 0, lat, lon)
        return (line["s12"] * np.sin(line["azi1"] * DEGREE), line["s12"] * np.cos(line["azi1"]
                                                                                  * DEGREE))

    for reach, box in ((2000, ((-25, 34), (25, 65))), (18000, ((-170, -45), (170, 89)))):
        yield geodesic_row(f"Azimuthal equidistant, {reach} km",
                           "azimuthal equidistant lat0=50 lon0=0" + GRS, f"to {reach:,} km", box,
                           equidistant)
    yield geodesic_row("Cassini-Soldner", "cassini lat0=0 lon0=0" + GRS,
                       "lon within 6, lat -80 to 80", ((-6, -80), (6, 80)),
                       lambda lon, lat: exact_cassini(A, FLAT, lon, lat),
                       "the registry's method is the series itself")
    yield exact_row("Orthographic", "orthographic lat0=50 lon0=0" + GRS, "lon within 60, lat 0 to 85",
                    ((-60, 0), (60, 85)), f.orthographic(e, 0, *rad(50)))
    yield exact_row("Gnomonic", "gnomonic lat0=50 lon0=0" + BALL, "lon within 60, lat 0 to 85",
                    ((-60, 0), (60, 85)), f.gnomonic(0, *rad(50)), axis=SPHERE, ecc=0.0)
    yield exact_row("Vertical perspective", "vertical perspective lat0=50 lon0=0 h0=0 h=5000000" + GRS,
                    "lon within 40, lat 15 to 80", ((-40, 15), (40, 80)),
                    f.perspective(e, 0, rad(50)[0], mp.mpf(5000000) / A))
    yield exact_row("Hotine oblique Mercator, A",
                    "oblique mercator variant a lat0=4 lon0=115 azimuth=53.3 gamma=53.13 k0=1" + GRS,
                    "lon within 10, lat -6 to 14", ((105, -6), (125, 14)),
                    f.hotine(e, *rad(115, 4, 53.3), rectified=rad(53.13)[0]))
    nz_axis = 6378388.0
    nz_e = float(np.sqrt((2 - 1 / 297) / 297))
    yield exact_row("New Zealand map grid", "new zealand map grid lat0=-41 lon0=173 ellps=intl",
                    "166 to 179 E, 34 to 48 S", ((166, -48), (179, -34)),
                    f.new_zealand(mp.mpf(nz_e), *rad(173, -41)), axis=nz_axis, ecc=nz_e)
    bessel_e = float(np.sqrt((2 - 1 / 299.1528128) / 299.1528128))
    krovak = f.krovak(mp.mpf(bessel_e))
    yield exact_row("Krovak", "EPSG:5514", "12 to 23 E, 47 to 51 N", ((12, 47), (23, 51)), krovak,
                    axis=6377397.155, ecc=bessel_e)
    lab_e = nz_e
    k = f.gauss_sphere(mp.mpf(lab_e), *rad("-18.9"))[2] * mp.mpf("0.9995")
    labrd = f.laborde(mp.mpf(lab_e), rad(46)[0], *rad("-18.9", "18.9"))
    yield exact_row("Laborde", "laborde lat0=-18.9 lon0=46 azimuth=18.9 k0=0.9995 ellps=intl",
                    "lon within 4, lat -27 to -11", ((42, -27), (50, -11)),
                    lambda lon, lat: [k * v for v in labrd(lon, lat)], axis=nz_axis, ecc=lab_e)
    yield exact_row("Sinusoidal", "sinusoidal lon0=0" + GRS, "lat -89 to 89", world,
                    f.sinusoidal(e, 0))
    yield exact_row("Equal Earth", "equal earth lon0=0" + GRS, "lat -89 to 89", world,
                    f.equal_earth(e, 0))
    for name, word, reference in (("Mollweide", "mollweide", f.mollweide(0)),
                                  ("Eckert IV", "eckert iv", f.eckert4(0)),
                                  ("Miller cylindrical", "miller", f.miller(0, 0))):
        yield exact_row(name, f"{word} lon0=0" + BALL, "sphere, lat -89 to 89", world, reference,
                        axis=SPHERE, ecc=0.0)
    yield exact_row("Van der Grinten", "van der grinten lon0=0" + BALL, "sphere, a quadrant",
                    ((-179, 0.5), (-0.5, 89)), f.van_der_grinten(0), axis=SPHERE, ecc=0.0)
    yield exact_row("Bipolar oblique conic", "bipolar conic" + BALL, "the Americas",
                    ((-108, -15), (-50, 60)), f.bipolar(scaled=True), axis=SPHERE, ecc=0.0)
    for name, word, peer, box in (
            ("Robinson", "robinson lon0=0", "robin", world),
            ("Swiss oblique Mercator", "somerc lat0=46.95 lon0=7.44 k0=1",
             "somerc +lat_0=46.95 +lon_0=7.44", ((5.9, 45.8), (10.5, 47.8))),
            ("Hotine oblique Mercator, B", "omerc lat0=4 lon0=115 azimuth=53.3 gamma=53.13 k0=1",
             "omerc +lat_0=4 +lonc=115 +alpha=53.3 +gamma=53.13", ((105, -6), (125, 14))),
            ("Guam", "guam lat0=13.5 lon0=144.75", "aeqd +guam +lat_0=13.5 +lon_0=144.75",
             ((144.5, 13.2), (145, 13.7))),
            ("Tilted perspective", "tilted perspective lat0=50 lon0=0 h=5000000 azimuth=0 tilt=20",
             "tpers +lat_0=50 +h=5000000 +azi=0 +tilt=20", ((-20, 35), (20, 65)))):
        ball = name in ("Robinson", "Tilted perspective")
        yield peer_row(name, word + (BALL if ball else GRS),
                       "sphere" if ball else "its country", box,
                       f"+proj={peer} " + (f"+R={SPHERE}" if ball else "+ellps=GRS80"),
                       SPHERE if ball else A,
                       note="other interpolation between the parallels" if name == "Robinson" else "")


def lines():
    g = Geodesic(A, FLAT)
    ours = Lines(0, A, FLAT)
    for longest, name in ((1e6, "to 1,000 km"), (1.9e7, "to 19,000 km")):
        start, azimuth, length, ends = lines_strewn(1000, longest)
        end = np.array([[p["lon2"], p["lat2"]] for p in ends])
        lon, lat, _ = ours.direct(start[:, 0], start[:, 1], azimuth, length)
        along = ours.inverse(start[:, 0], start[:, 1], *end.T)[0]
        row = Row(f"Geodesics, {name}", "`Geodesic`", "all azimuths", "GeographicLib", 1000,
                  Error.of(on_the_ground(A, end * DEGREE, np.column_stack([lon, lat]) * DEGREE)),
                  Error.of(np.abs(along - length)), note="direct; length of the inverse")
        row.extra.update(azimuth=azimuth, along=np.abs(along - length), length=length)
        yield row
    pairs = scatter((-179.5, -60), (180, 60), 400)
    truth = [g.Inverse(lat, 0, -lat + 0.3, lon) for lon, lat in
             zip(179 + (pairs[:, 0] + 180) / 360, pairs[:, 1])]
    got = ours.inverse(np.zeros(400), pairs[:, 1], 179 + (pairs[:, 0] + 180) / 360,
                       -pairs[:, 1] + 0.3)[0]
    yield Row("Geodesics, nearly antipodal", "`Geodesic`", "within a degree of the antipode",
              "GeographicLib", 400, None, Error.of(np.abs(got - [t["s12"] for t in truth])))
    corners = np.array([[-5, 48], [10, 40], [40, 55], [20, 70], [-10, 65.0]])
    p = g.Polygon()
    for lon, lat in corners:
        p.AddPoint(lat, lon)
    _, perimeter, area = p.Compute()
    got = ours.polygon(*corners.T)
    yield Row("Polygon", "`Geodesic`", "a polygon of 6 million km²", "GeographicLib", 1,
              Error.of(np.array([abs(got[0] - perimeter)])), None,
              Error.of(np.array([abs(got[1] / area - 1)]), ""), note="perimeter; area, relative")
    count = 200
    start = scatter((-120, -60), (120, 60), count)
    azimuth = (np.arange(count) * 137.50776405) % 360 - 180
    length = 2e6 * (0.02 + 0.98 * ((np.arange(count) * 0.7548776662) % 1))
    end = np.array([rhumb_truth(lon, lat, azi, s)
                    for (lon, lat), azi, s in zip(start, azimuth, length)])
    rhumb = Lines(1, A, FLAT)
    lon, lat, _ = rhumb.direct(start[:, 0], start[:, 1], azimuth, length)
    along = rhumb.inverse(start[:, 0], start[:, 1], *(end / DEGREE).T)[0]
    yield Row("Rhumb lines", "`Rhumb`", "lat -60 to 60, to 2,000 km", MP, count,
              Error.of(on_the_ground(A, end, np.column_stack([lon, lat]) * DEGREE)),
              Error.of(np.abs(along - length)), note="direct; length of the inverse")


def others():
    yield from magnetics()
    yield from transformations()
    yield from texts()


def magnetics():
    import harmonics
    from library import SOURCE
    models = {}
    for name, date in (("WMM2025", 2027.3), ("IGRF-14", 2026.5), ("IGRF-14", 1952.5),
                       ("IGRF-13", 2021.0)):
        model = harmonics.of_store(SOURCE / "data", name, date)
        place = scatter((-180, -89), (180, 89), 24)
        three = np.column_stack([place, 1e5 * (np.arange(24) % 5)])
        got = magnetic_field(name, date, three)
        with mp.workdps(30):
            truth = [harmonics.field(model, float(p[0]), float(p[1]), mp.mpf(float(p[2])))
                     for p in three]
        yield Row(f"Magnetic field, {name} at {date}", "`MagneticModel`, `TWhar_*`, `TWmag_*`",
                  "lat -89 to 89, to 400 km up", "spherical harmonics, 30 digits", 24,
                  Error.of(apart(truth, got), "nT"))


def transformations():
    from pyproj import Transformer
    turn = "+proj=unitconvert +xy_in=deg +xy_out=rad"
    for name, source, target, operation, box, steps in (
            ("three translations", "EPSG:4230", "EPSG:4326", "EPSG:1133", ((-5, 40), (15, 60)),
             "+step +proj=cart +ellps=intl +step +proj=helmert +x=-87 +y=-98 +z=-121 "
             "+step +inv +proj=cart +ellps=WGS84"),
            ("seven parameters", "EPSG:4314", "EPSG:4326", "EPSG:1777", ((6, 47), (15, 55)),
             "+step +proj=cart +ellps=bessel +step +proj=helmert +x=598.1 +y=73.7 +z=418.2 +rx=0.202 "
             "+ry=0.045 +rz=-2.455 +s=6.7 +convention=position_vector +step +inv +proj=cart "
             "+ellps=WGS84"),
            ("NTv2 grid", "EPSG:4314", "EPSG:4258", "EPSG:15948", ((6, 47.5), (15, 55)),
             "+step +proj=hgridshift +grids=BETA2007.gsb")):
        degrees = scatter(*box, 300)
        try:
            ours = Transformation(source, target, operation)
        except ValueError as reason:
            print(f"no row for {name}: {reason}")
            continue
        peer = Transformer.from_pipeline(
            f"+proj=pipeline +step {turn} {steps} +step +inv {turn}")
        exact = np.column_stack(peer.transform(*degrees.T))
        got = ours(degrees)[:, :2]
        back = ours(got, inverse=True)[:, :2]
        yield Row(f"Datum operation, {name} ({operation})", "`Transformation`", "its area",
                  "PROJ, the same operation", 300,
                  Error.of(on_the_ground(A, exact * DEGREE, got * DEGREE)),
                  Error.of(on_the_ground(A, degrees * DEGREE, back * DEGREE)),
                  note="inverse: the way back")


def texts():
    errors = []
    for i in range(500):
        d, m, s = i % 180, (i * 7) % 60, f"{(i * 13) % 60}.{(i * 7919) % 100000:05d}"
        truth = mp.mpf(d) + mp.mpf(m) / 60 + mp.mpf(s) / 3600
        got = parse_angle(f"{d}°{m}'{s}\"")
        errors.append(abs(float((mp.mpf(float(got)) - truth))))
    yield Row("Angles as text", "`parse_angle`", "degrees, minutes, seconds to 5 decimals", MP, 500,
              Error.of(np.array(errors), "degrees"))
    place = scatter((-179, -79), (179, 83), 500)
    got = np.array([position_of_mgrs(mgrs_of(lon, lat, 11)) for lon, lat in place])
    yield Row("Military grid references", "`format_mgrs`, `parse_mgrs`",
              "lat -79 to 83, squares of 1 µm", "the way back", 500, None,
              Error.of(on_the_ground(6378137.0, place * DEGREE, got * DEGREE)))
