"""The objects of the systems layer."""

import re
import subprocess

import mpmath as mp
import numpy as np
from geographiclib.geodesic import Geodesic

import formulas as f
import harmonics
import methods
from geodesy import lines_strewn, rhumb_truth
from library import (BUILD, SOURCE, Lines, Transformation, magnetic_field, mgrs_of, parse_angle,
                     parse_position, position_of_mgrs)
from measure import (A, DEGREE, E, FLAT, MP, Error, Row, apart, e, in_turn, on_the_ground, scatter)


def rows():
    return in_turn(methods.rows, registry, lines, magnetics, operations, heights, texts)


def registry():
    """What tests/systems finds beside PROJ, over every projected system and operation."""
    run = subprocess.run([BUILD / "tests" / "tidewater_systems_tests",
                          "--gtest_filter=ProjectedSystems.*:DatumOperations.*"], capture_output=True,
                         text=True, check=True, cwd=SOURCE)
    found = re.search(r"(\d+) projected systems, (\d+) compared with PROJ, (\d+) of them beyond 1 mm.*"
                      r"worst (\S+) m, 95 in 100 within (\S+) m", run.stdout)
    systems, compared, beyond = map(int, found.groups()[:3])
    row = Row("Projected systems of the registry", "`Projection`, `Transformation`",
              f"{systems:,}, at 16 points of their areas", "PROJ", compared,
              Error(*map(float, found.groups()[3:])),
              note=f"both ways; without {beyond} in which PROJ departs from the registry's text by more than "
                   "1 mm: docs/systems.md")
    row.extra.update(systems=systems, within=compared - beyond)
    yield row
    found = re.search(r"(\d+) operations by parameters, the worst (\S+) m, 95 in 100 within (\S+) m", run.stdout)
    yield Row("Datum operations of the registry by parameters", "`Transformation`",
              "3 points of their areas", "PROJ", int(found[1]), Error(*map(float, found.groups()[1:])),
              note="both ways")


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
    yield Row("Polygon, its perimeter and as scale its relative area", "`Geodesic`", "a polygon of 6 million km²", "GeographicLib", 1,
              Error.of(np.array([abs(got[0] - perimeter)])), None,
              Error.of(np.array([abs(got[1] / area - 1)]), ""))
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


def magnetics():
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


def operations():
    from pyproj import Transformer
    turn = "+proj=unitconvert +xy_in=deg +xy_out=rad"
    cart = "+step +proj=cart +ellps={} +step +proj=helmert {} +step +inv +proj=cart +ellps={}"
    yield geocentric()
    for name, source, target, operation, box, steps in (
            ("three translations", "EPSG:4230", "EPSG:4326", "EPSG:1133", ((-5, 40), (15, 60)),
             cart.format("intl", "+x=-87 +y=-98 +z=-121", "WGS84")),
            ("seven parameters", "EPSG:4314", "EPSG:4326", "EPSG:1777", ((6, 47), (15, 55)),
             cart.format("bessel", "+x=598.1 +y=73.7 +z=418.2 +rx=0.202 +ry=0.045 +rz=-2.455 +s=6.7 "
                         "+convention=position_vector", "WGS84")),
            ("NTv2 grid", "EPSG:4314", "EPSG:4258", "EPSG:15948", ((6, 47.5), (15, 55)),
             "+step +proj=hgridshift +grids=BETA2007.gsb")):
        degrees = scatter(*box, 300)
        ours = Transformation(source, target, operation)
        peer = Transformer.from_pipeline(
            f"+proj=pipeline +step {turn} {steps} +step +inv {turn}")
        exact = np.column_stack(peer.transform(*degrees.T))
        got = ours(degrees)[:, :2]
        back = ours(got, inverse=True)[:, :2]
        yield Row(f"Datum operation, {name} ({operation})",
                  "`Transformation`, `ShiftGrid`" if "grid" in name else "`Transformation`", "its area",
                  "PROJ, the same operation", 300,
                  Error.of(on_the_ground(A, exact * DEGREE, got * DEGREE)),
                  Error.of(on_the_ground(A, degrees * DEGREE, back * DEGREE)),
                  note="inverse: the way back; the systems have no heights, which are 0 both ways")


def geocentric():
    place = np.column_stack([scatter((-180, -90), (180, 90), 500),
                             -100 + 9100 * (np.arange(500) * 0.6180339887498949 % 1)])
    ours = Transformation("EPSG:4979", "EPSG:4978")
    flat = 1 / 298.257223563
    ecc = mp.mpf(np.sqrt(flat * (2 - flat)))
    exact = [[A * v for v in f.geocentric(ecc, mp.radians(mp.mpf(p[0])), mp.radians(mp.mpf(p[1])),
                                          mp.mpf(p[2]) / A)] for p in place]
    got = ours(place)
    back = ours(np.array([[float(v) for v in row] for row in exact]), inverse=True)
    error = np.hypot(on_the_ground(A, place * DEGREE, back * DEGREE), place[:, 2] - back[:, 2])
    return Row("Geocentric coordinates", "`Transformation`", "all latitudes, to 9 km up", MP, 500,
               Error.of(apart(exact, got)), Error.of(error))


def heights():
    """Heights above EGM96, bilinear on its grid of 15 minutes."""
    from pyproj import Transformer
    turn = "+proj=unitconvert +xy_in=deg +xy_out=rad"
    peer = Transformer.from_pipeline(f"+proj=pipeline +step {turn} +step +proj=vgridshift "
                                     f"+grids=egm96_15.gtx +multiplier=1 +step +inv {turn}")
    ours = Transformation("EPSG:4326+5773", "EPSG:4979")
    place = np.column_stack([scatter((-179.9, -89.9), (179.9, 89.9), 500), np.full(500, 100.0)])
    exact = np.column_stack(peer.transform(*place.T))
    got = ours(place)
    yield Row("Heights by a geoid grid, EGM96", "`Transformation`, `GeoidGrid`", "the earth", "PROJ", 500,
              Error.of(np.abs(got[:, 2] - exact[:, 2])),
              Error.of(np.abs(ours(got, inverse=True)[:, 2] - 100)), note="inverse: the way back")


def texts():
    errors = []
    for i in range(500):
        d, m, s = i % 180, (i * 7) % 60, f"{(i * 13) % 60}.{(i * 7919) % 100000:05d}"
        truth = mp.mpf(d) + mp.mpf(m) / 60 + mp.mpf(s) / 3600
        got = parse_angle(f"{d}°{m}'{s}\"")
        errors.append(abs(float((mp.mpf(float(got)) - truth))))
    yield Row("Angles as text", "`parse_angle`", "degrees, minutes, seconds to 5 decimals", MP, 500,
              Error.of(np.array(errors), "degrees"))
    place = scatter((-179, -89), (179, 89), 500)
    got = np.array([parse_position(f"{lat:.12f} {lon:.12f}") for lon, lat in place])
    written = np.array([[float(f"{v:.12f}") for v in p] for p in place])
    yield Row("Positions as text", "`parse_position`", "decimal degrees to 12 decimals", "the nearest double",
              500, Error.of(np.abs(got - written).max(axis=1), "degrees"))
    place = scatter((-179, -79), (179, 83), 500)
    got = np.array([position_of_mgrs(mgrs_of(lon, lat, 11)) for lon, lat in place])
    yield Row("Military grid references", "`format_mgrs`, `parse_mgrs`",
              "lat -79 to 83, squares of 1 µm", "the way back", 500, None,
              Error.of(on_the_ground(6378137.0, place * DEGREE, got * DEGREE)))
