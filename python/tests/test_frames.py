"""pandas and GeoPandas."""

import re

import numpy as np
import pytest

pd = pytest.importorskip("pandas")
geopandas = pytest.importorskip("geopandas")
geometry = pytest.importorskip("shapely.geometry")

import tidewater
from tidewater import frames


@pytest.fixture
def places():
    geometries = [geometry.Point(2.35, 48.85), geometry.Point(5.37, 43.3, 20),
                  geometry.Polygon([(0, 45), (1, 45), (1, 46)], [[(.5, 45.1), (.8, 45.1), (.8, 45.5)]]),
                  geometry.MultiLineString([[(0, 47), (1, 48)], [(2, 49), (3, 50)]]), None,
                  geometry.Point()]
    return geopandas.GeoDataFrame({"name": list("abcdef")}, geometry=geometries, crs="EPSG:4326",
                                  index=list("uvwxyz"))


def coordinates(shape):
    """All coordinates of a geometry, in the order of its text."""
    return [float(number) for number in re.findall(r"-?\d+\.?\d*", shape.wkt)]


def test_to_system_is_to_crs(places):
    before = places.copy()
    moved = tidewater.to_system(places, "EPSG:2154")
    expected = places.to_crs("EPSG:2154")
    assert moved.crs == expected.crs and list(moved.index) == list("uvwxyz")
    for one, other in zip(moved.geometry, expected.geometry):
        assert (one is None) == (other is None)
        if one is not None:
            assert one.has_z == other.has_z
            np.testing.assert_allclose(coordinates(one), coordinates(other), atol=1e-4)
    assert places.geom_equals(before).iloc[:4].all()
    series = tidewater.to_system(places.geometry, "EPSG:2154")
    assert isinstance(series, geopandas.GeoSeries) and series.crs == expected.crs
    with pytest.raises(ValueError, match="no system"):
        tidewater.to_system(geopandas.GeoSeries([geometry.Point(1, 2)]), "EPSG:2154")


def test_other_geometry_column(places):
    moved = frames.to_system(places.rename_geometry("place"), 2154)
    assert moved.geometry.name == "place"


def test_series_ride_the_ufunc():
    table = pd.DataFrame({"lon": [2.35, 5.37], "lat": [48.85, 43.3]}, index=["Paris", "Marseille"])
    t = tidewater.Transformation("EPSG:4326", "EPSG:2154")
    x, y = t(table.lon, table.lat)
    assert isinstance(x, pd.Series) and list(x.index) == ["Paris", "Marseille"]
    assert x["Paris"] == t(2.35, 48.85)[0]
    columns = table.lon.tidewater.transform(table.lat, "EPSG:4326", "EPSG:2154")
    np.testing.assert_array_equal(columns.x, x)


def test_text_in_columns():
    texts = pd.Series(["48°30'N", "2°15'W", None], index=[5, 6, 7])
    degrees = texts.tidewater.parse()
    assert degrees[5] == 48.5 and degrees[6] == -2.25 and np.isnan(degrees[7])
    assert degrees[:6].tidewater.format("seconds", marks="symbols", precision=0)[5] == "48°30′00″"
    position = pd.Series(["48°30'N 2°15'E"]).tidewater.parse_position()
    assert position.lon[0] == 2.25 and position.lat[0] == 48.5
