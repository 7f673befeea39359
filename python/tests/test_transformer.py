"""Code that was written for pyproj, with another import."""

import numpy as np
import pyproj
import pytest

import tidewater
from tidewater import Transformer

PAIR = ("EPSG:32631", "EPSG:32632")


@pytest.fixture(params=[False, True], ids=["own axes", "xy"])
def both(request):
    return [maker.from_crs("EPSG:4326", "EPSG:3035", always_xy=request.param)
            for maker in (Transformer, pyproj.Transformer)]


@pytest.mark.parametrize("x, y", [(9.5, 48.0), ([9.5, 10], [48.0, 50]), ((9.5,), (48.0,)),
                                  (np.array([9.5]), np.array([48.0])), (9, 48)])
def test_same_answer_in_the_same_form(both, x, y):
    for direction in ("FORWARD", "INVERSE", "IDENT"):
        if direction == "INVERSE":
            x, y = both[1].transform(x, y)
        one, other = (t.transform(x, y, direction=direction) for t in both)
        assert type(one[0]) is type(other[0])
        np.testing.assert_allclose(one, other, atol=1e-6)


def test_heights_and_radians():
    one, other = (maker.from_crs("EPSG:4979", "EPSG:4978", always_xy=True)
                  for maker in (Transformer, pyproj.Transformer))
    np.testing.assert_allclose(one.transform(2.0, 48.0, 100.0), other.transform(2.0, 48.0, 100.0),
                               atol=1e-6)
    np.testing.assert_allclose(one.transform(0.1, 0.8, 9.0, radians=True),
                               other.transform(0.1, 0.8, 9.0, radians=True), atol=1e-6)


def test_failures_are_infinite(both):
    for t in both:
        assert t.transform(500.0, 500.0) == (np.inf, np.inf)
        assert np.isinf(t.transform([500.0, 500.0], [500.0, 500.0])[0]).all()
    with pytest.raises(tidewater.PointError):
        both[0].transform(500.0, 500.0, errcheck=True)


def test_in_place():
    x, y = np.array([5e5, 6e5]), np.array([5e6, 5.1e6])
    expected = pyproj.Transformer.from_crs(*PAIR, always_xy=True).transform(x, y)
    result = Transformer.from_crs(*PAIR, always_xy=True).transform(x, y, inplace=True)
    assert result[0] is x
    np.testing.assert_allclose((x, y), expected, atol=1e-6)


def test_itransform():
    points = [(5e5, 5e6), (6e5, 5.1e6)]
    one, other = (list(maker.from_crs(*PAIR, always_xy=True).itransform(points))
                  for maker in (Transformer, pyproj.Transformer))
    np.testing.assert_allclose(one, other, atol=1e-6)


def test_where_it_differs():
    with pytest.raises(tidewater.Error, match="Pipelines"):
        Transformer.from_pipeline("+proj=pipeline")
    t = Transformer.from_crs(*PAIR)
    with pytest.raises(tidewater.Error, match="epoch"):
        t.transform(1, 2, 3, 2020.0)
    with pytest.raises(tidewater.Error, match="not to 1e-09 m"):
        Transformer.from_crs("EPSG:4277", "EPSG:4326", accuracy=1e-9)
    assert Transformer.from_crs("EPSG:4277", "EPSG:4326",
                                area_of_interest=(-3, 50, 1, 53)).accuracy > 0
