"""Geodesics and rhumb lines beside pyproj and by hand."""

import math
import pickle

import numpy as np
import pyproj
import pytest
from hypothesis import given
from hypothesis import strategies as st

from tidewater import Ellipsoid, Geodesic, Rhumb

GEODESIC = Geodesic()
PEER = pyproj.Geod(ellps="WGS84")
LONGITUDES = st.floats(-180, 180)
LATITUDES = st.floats(-90, 90)


def test_inverse_agrees_with_pyproj():
    random = np.random.default_rng(1)
    lon1, lon2 = random.uniform(-180, 180, (2, 20000))
    lat1, lat2 = random.uniform(-90, 90, (2, 20000))
    course = GEODESIC.inverse(lon1, lat1, lon2, lat2)
    azimuth1, azimuth2, length = PEER.inv(lon1, lat1, lon2, lat2)
    assert np.abs(course.length - length).max() < 2e-8
    around = np.abs(course.azimuth1 - azimuth1)
    assert np.minimum(around, 360 - around).max() < 1e-7
    end = GEODESIC.direct(lon1, lat1, course.azimuth1, course.length)
    assert np.abs(PEER.inv(lon2, lat2, end.lon, end.lat)[2]).max() < 2e-8


@given(LONGITUDES, LATITUDES, st.floats(-180, 180), st.floats(0, 1.9e7))
def test_there_and_back(lon, lat, azimuth, length):
    lon2, lat2, _ = GEODESIC.direct(lon, lat, azimuth, length)
    assert GEODESIC.inverse(lon, lat, lon2, lat2)[0] == pytest.approx(length, abs=1e-7)


def test_results_have_names_whatever_the_arguments_are():
    for kind in (float, np.float64, np.array):
        there = [kind(value) for value in (-4.0, 48.0, 2.0, 49.0)]
        course = GEODESIC.inverse(*there)
        assert course.length == pytest.approx(456_300, abs=1500)  # 442.5 km east, 111.2 km north
        end = GEODESIC.direct(there[0], there[1], course.azimuth1, course.length)
        assert (end.lon, end.lat) == pytest.approx((2, 49), abs=1e-9)
        assert end.azimuth == pytest.approx(course.azimuth2, abs=1e-9)
    assert type(course) is type(GEODESIC.inverse(-4.0, 48.0, 2.0, 49.0))


@given(LATITUDES, LATITUDES)
def test_rhumb_along_a_meridian_is_the_geodesic(lat1, lat2):
    there = Rhumb().inverse(7.0, lat1, 7.0, lat2)
    assert there[0] == pytest.approx(GEODESIC.inverse(7.0, lat1, 7.0, lat2)[0], abs=1e-7)


def test_rhumb_on_a_sphere():
    # Along a parallel of 60 degrees a rhumb line is half as long as on the equator.
    sphere = Rhumb(a=1, f=0)
    assert sphere.inverse(0.0, 60.0, 90.0, 60.0) == pytest.approx((math.pi / 4, 90, 90))
    assert sphere.direct(0.0, 60.0, 90.0, math.pi / 4) == pytest.approx((90, 60, 90))


def test_points_and_polygons():
    line = GEODESIC.points([2.35, 2.35], [48.85, 48.85], [-74.0, 139.7], [40.7, 35.7], 5)
    assert line.lon.shape == (2, 5)
    between = PEER.npts(2.35, 48.85, -74.0, 40.7, 3)
    np.testing.assert_allclose(np.column_stack(line[:2])[0:1].ravel()[:1], [2.35])
    np.testing.assert_allclose(line.lon[0, 1:4], [p[0] for p in between], atol=1e-9)
    np.testing.assert_allclose(line.lat[0, 1:4], [p[1] for p in between], atol=1e-9)
    ring = [0.0, 10.0, 10.0, 0.0], [0.0, 0.0, 10.0, 10.0]
    area, perimeter = PEER.polygon_area_perimeter(*ring)
    assert GEODESIC.polygon(*ring) == pytest.approx((perimeter, area), rel=1e-12)
    assert GEODESIC.polygon(ring[0][::-1], ring[1][::-1]).area == pytest.approx(-area, rel=1e-12)
    with pytest.raises(ValueError):
        GEODESIC.polygon([0, 1], [0])
    with pytest.raises(ValueError):
        GEODESIC.points(0, 0, 1, 1, 1)


def test_area_column_closes_a_triangle():
    lon, lat = np.array([0.0, 30, 10]), np.array([0.0, 10, 40])
    parts = GEODESIC.inverse(lon, lat, np.roll(lon, -1), np.roll(lat, -1), area=True)
    assert -parts[3].sum() == pytest.approx(GEODESIC.polygon(lon, lat).area, rel=1e-12)


def test_failures_and_kinds():
    assert math.isnan(GEODESIC.inverse(0.0, 91.0, 0.0, 0.0)[0])
    words = GEODESIC.inverse(0, [91, 0], 0, 0, errors="words")[-1]
    assert words[0] != words[1]
    assert Geodesic(Ellipsoid("GRS 1980")).a == 6378137
    for lines in (Geodesic(a=6.4e6, f=0.001), Rhumb("clarke 1866")):
        again = pickle.loads(pickle.dumps(lines))
        assert type(again) is type(lines) and (again.a, again.f) == (lines.a, lines.f)
        assert again.inverse(0.0, 0.0, 1.0, 1.0) == lines.inverse(0.0, 0.0, 1.0, 1.0)
    with pytest.raises(ValueError):
        Geodesic(a=-1, f=0)
    into = np.zeros(3), np.zeros(3), np.zeros(3)
    assert GEODESIC.inverse(0, 0, [1, 2, 3], 0, out=into)[0] is into[0]
