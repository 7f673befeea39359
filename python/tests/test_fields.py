"""Projections, geoid grids, magnetics and text."""

import pickle

import numpy as np
import pyproj
import pytest
from hypothesis import given
from hypothesis import strategies as st

import tidewater
from tidewater import GeoidGrid, MagneticModel, Projection, System

LAMBERT = Projection("lambert conformal", {"latitude of origin": 46.5}, "GRS 1980", lon0=3,
                     lat1=44, lat2=49, x0=700000, y0=6600000)


def test_factors_agree_with_pyproj(france):
    expected = pyproj.Proj("EPSG:2154").get_factors(*france)
    factors = LAMBERT.factors(*france)
    np.testing.assert_allclose(factors.meridional, expected.meridional_scale, atol=1e-8)
    np.testing.assert_allclose(factors.parallel, expected.parallel_scale, atol=1e-8)
    np.testing.assert_allclose(factors.areal, expected.areal_scale, atol=1e-8)
    np.testing.assert_allclose(factors.convergence, expected.meridian_convergence, atol=1e-6)
    assert factors.angular.max() < 1e-5
    assert LAMBERT.factors(3.0, 46.5)[3] == pytest.approx(0, abs=1e-9)


def test_projection(france):
    same = System("EPSG:2154").projection
    np.testing.assert_allclose(LAMBERT(*france), same(*france), atol=1e-8)
    assert LAMBERT.inverse(*LAMBERT(2.35, 48.85)) == pytest.approx((2.35, 48.85), abs=1e-11)
    for projection in (LAMBERT, LAMBERT.inverse, same, same.inverse):
        again = pickle.loads(pickle.dumps(projection))
        assert again(3.5, 47.0) == pytest.approx(projection(3.5, 47.0))
    assert System("EPSG:4326").projection is None
    assert "Transverse Mercator" in Projection.methods()
    with pytest.raises(tidewater.Error):
        Projection("lambert conformal", nonsense=3)


def test_geoid(grid_folder):
    grid = GeoidGrid("egm96_15.gtx", [grid_folder])
    # Nodes and midpoints of a row: the mean of two nodes by bilinear interpolation.
    nodes = grid.undulation([2.0, 2.25], 48.0)
    assert grid.undulation(2.125, 48.0) == pytest.approx(nodes.mean(), abs=1e-9)
    peer = pyproj.Transformer.from_pipeline(
        "+proj=pipeline +step +proj=unitconvert +xy_in=deg +xy_out=rad "
        f"+step +inv +proj=vgridshift +grids={grid_folder}/egm96_15.gtx +multiplier=1 "
        "+step +proj=unitconvert +xy_in=rad +xy_out=deg")
    random = np.random.default_rng(3)
    lon, lat = random.uniform(-179, 179, 500), random.uniform(-89, 89, 500)
    height = peer.transform(lon, lat, np.zeros(500))[2]
    sign = np.sign(height @ grid.undulation(lon, lat))
    np.testing.assert_allclose(grid.undulation(lon, lat), sign * height, atol=1e-4)
    _, _, above = grid(lon, lat, 100.0)
    np.testing.assert_allclose(above, 100 + grid.undulation(lon, lat), atol=1e-9)
    np.testing.assert_allclose(grid.inverse(lon, lat, above)[2], 100, atol=1e-9)
    # Greece and Iceland stand high, the Indian Ocean lies low.
    assert grid.undulation(78.8, 4.7) < -90 and grid.undulation(-20.0, 65.0) > 55
    with pytest.raises(tidewater.Error):
        GeoidGrid("nothing.gtx")


def test_magnetic():
    model = MagneticModel("WMM2025", year=2025)
    field = model.field([0, 120, 240], [80, 0, -80])
    # Test values of the WMM2025 technical report, at height 0, to the digits printed.
    np.testing.assert_allclose(field.north, [6521.6, 39677.8, 6117.5], atol=0.051)
    np.testing.assert_allclose(field.east, [145.9, -109.6, 15751.9], atol=0.051)
    np.testing.assert_allclose(field.down, [54791.5, -10580.2, -52022.5], atol=0.051)
    np.testing.assert_allclose(field.declination, [1.28, -0.16, 68.78], atol=0.0051)
    np.testing.assert_allclose(field.inclination, [83.21, -14.93, -72.00], atol=0.0051)
    # The figures of a field hang together.
    np.testing.assert_allclose(np.hypot(field.north, field.east), field.horizontal, rtol=1e-12)
    np.testing.assert_allclose(np.hypot(field.horizontal, field.down), field.total, rtol=1e-12)
    np.testing.assert_allclose(
        np.degrees(np.arctan2(field.east, field.north)), field.declination, rtol=1e-12)
    assert np.shape(model.declination(0, 80)) == ()
    later = MagneticModel("WMM2025", year=2026).field(2.0, 48.0)
    yearly = model.yearly(2.0, 48.0)
    assert later.total - model.field(2.0, 48.0).total == pytest.approx(yearly.total, abs=0.05)
    assert np.isnan(model.field(0, 91).total)
    assert {"WMM2025", "IGRF-13", "IGRF-14"} <= set(MagneticModel.models())
    assert MagneticModel("IGRF", year=2026).name == "IGRF-14"
    assert MagneticModel("igrf13", year=2020).name == "IGRF-13"
    for year in (1950, np.nan, np.inf):
        with pytest.raises(tidewater.Error):
            MagneticModel("WMM2025", year=year)
    assert pickle.loads(pickle.dumps(model)).field(1, 2) == model.field(1, 2)


@given(st.floats(-179.9, 179.9), st.sampled_from(["degrees", "minutes", "seconds"]),
       st.sampled_from(["none", "symbols", "plain", "colons", "blanks"]))
def test_text_round_trip(angle, form, marks):
    text = tidewater.format(angle, form, marks=marks, precision=6, axis="longitude")
    assert tidewater.parse(text) == pytest.approx(angle, abs=1e-6)


def test_text():
    texts = np.array([["48°51'24\"N", "N 48 51.4"], ["rubbish", None]], dtype=object)
    degrees = tidewater.parse(texts, "latitude")
    assert degrees.shape == (2, 2)
    assert degrees[0] == pytest.approx([48 + 51 / 60 + 24 / 3600, 48 + 51.4 / 60])
    assert np.isnan(degrees[1]).all()
    degrees, reasons = tidewater.parse(texts, errors="words")
    assert reasons[0, 0] == "" and "rubbish" in reasons[1, 0]
    with pytest.raises(tidewater.Error, match="Text 2: "):
        tidewater.parse(texts, errors="raise")
    assert tidewater.format(48.5, "seconds", marks="symbols", precision=0,
                            axis="latitude") == "48°30′00″N"
    assert tidewater.format([[1.5], [2.5]], precision=1).tolist() == [["1.5"], ["2.5"]]
    assert tidewater.parse_position("48°30'N 2°15'E")[:2] == (2.25, 48.5)
    reference = tidewater.format_mgrs([2.35, 2.35], [48.85, 89.0])
    lon, lat = tidewater.parse_mgrs(reference)
    np.testing.assert_allclose(lat, [48.85, 89.0], atol=1e-5)
    with pytest.raises(ValueError):
        tidewater.format(1.0, "turns")
