"""Transformations: values, the laws of ufuncs, errors."""

import os
import pickle
import subprocess
import sys
import threading

import numpy as np
import pyproj
import pytest
from hypothesis import given
from hypothesis import strategies as st

import tidewater
from tidewater import PointError, System, Transformation

LAMBERT = Transformation("EPSG:4326", "EPSG:2154")


def test_published_point():
    # EPSG Guidance Note 7-2, Transverse Mercator: British National Grid on OSGB36.  The Note's
    # shorter series ends 8 mm from the projection.
    t = Transformation("EPSG:4277", "EPSG:27700")
    assert t(0.5, 50.5) == pytest.approx((577274.99, 69740.50), abs=0.01)
    assert t.inverse(577274.99, 69740.50) == pytest.approx((0.5, 50.5), abs=1e-7)


@pytest.mark.parametrize("source, target", [
    ("EPSG:4326", "EPSG:2154"), ("EPSG:32631", "EPSG:32632"), ("EPSG:32631", "EPSG:3857"),
    ("EPSG:2154", "EPSG:3035"), ("EPSG:4258", "EPSG:3034"), ("EPSG:4326", "EPSG:3395"),
    ("EPSG:4326", "EPSG:32661"), ("EPSG:21781", "EPSG:4326"), ("EPSG:4326", "EPSG:28992"),
    ("EPSG:4326", "EPSG:5514"), ("EPSG:4326", "EPSG:2056")])
def test_agrees_with_pyproj(france, source, target):
    # The same operation on both sides: best operations differ where grids are installed.
    lon, lat = france
    t = Transformation(source, target, operation="no shift")
    to_source = pyproj.Transformer.from_crs(
        pyproj.CRS(source).geodetic_crs, source, always_xy=True)
    to_target = pyproj.Transformer.from_crs(
        pyproj.CRS(target).geodetic_crs, target, always_xy=True)
    x, y = to_source.transform(lon, lat)
    expected = to_target.transform(lon, lat)
    got = t(x, y)
    tolerance = 1e-3 if max(np.abs(expected[0]).max(), 1e4) > 400 and pyproj.CRS(
        target).is_projected else 1e-8
    assert np.abs(got[0] - expected[0]).max() < tolerance
    assert np.abs(got[1] - expected[1]).max() < tolerance
    back = t.inverse(*got)
    tolerance = 1e-3 if pyproj.CRS(source).is_projected else 1e-8
    assert np.abs(back[0] - x).max() < tolerance
    assert np.abs(back[1] - y).max() < tolerance


@pytest.mark.parametrize("system", ["EPSG:2154", "utm:31N", "EPSG:3035", "EPSG:3857", "EPSG:4978"])
@given(lon=st.floats(-5, 9), lat=st.floats(41, 52), height=st.floats(-1000, 9000))
def test_there_and_back(system, lon, lat, height):
    t = Transformation("EPSG:4979" if system == "EPSG:4978" else "EPSG:4326", system)
    back = t.inverse(*t(lon, lat, height))
    assert back == pytest.approx((lon, lat, height), abs=1e-8)  # a millimetre in degrees


def test_with_a_grid(grid_folder, france):
    lon, lat = np.clip(france[0], -3, 7), np.clip(france[1], 43, 50)
    t = Transformation("EPSG:4275", "EPSG:4171", operation="grid:ntf_r93.gsb",
                       grid_folders=[grid_folder])
    peer = pyproj.Transformer.from_pipeline(
        "+proj=pipeline +step +proj=unitconvert +xy_in=deg +xy_out=rad "
        f"+step +proj=hgridshift +grids={grid_folder}/ntf_r93.gsb "
        "+step +proj=unitconvert +xy_in=rad +xy_out=deg")
    expected = peer.transform(lon, lat)
    inside = np.isfinite(expected[0])
    assert inside.sum() > 1000
    got = t(lon, lat)
    assert np.abs(got[0] - expected[0])[inside].max() < 1e-9
    assert np.abs(got[1] - expected[1])[inside].max() < 1e-9
    grid = tidewater.ShiftGrid("ntf_r93.gsb", [grid_folder])
    np.testing.assert_allclose(grid(lon, lat)[0][inside], expected[0][inside], atol=1e-9)
    there = grid(2.0, 47.0)
    assert grid.inverse(*there) == pytest.approx((2.0, 47.0), abs=1e-10)
    assert np.isnan(grid(-100.0, 47.0)).all()
    assert grid(-100.0, 47.0, errors="words")[2] != tidewater.SUCCESS
    assert pickle.loads(pickle.dumps(grid.inverse))(*there) == grid.inverse(*there)


def test_scalars_in_scalars_out():
    x, y = LAMBERT(2.35, 48.85)
    assert type(x) is float and type(y) is float
    assert LAMBERT(2.35, 48.85, 35.0)[2] == 35.0
    assert type(LAMBERT(2, 48)[0]) is np.float64
    assert LAMBERT(2, 48) == LAMBERT(2.0, 48.0)
    assert type(LAMBERT(np.float32(2), np.float32(48))[0]) is np.float32
    assert LAMBERT(np.array([2.0]), np.array([48.0]))[0].shape == (1,)
    assert type(LAMBERT(np.array(2.0), np.array(48.0))[0]) is np.float64


def test_is_a_ufunc():
    assert isinstance(LAMBERT.ufunc, np.ufunc) and isinstance(LAMBERT.ufunc3, np.ufunc)
    assert (LAMBERT.ufunc.nin, LAMBERT.ufunc.nout) == (2, 2)
    assert LAMBERT.ufunc.types == ["ff->ff", "dd->dd"]
    assert LAMBERT.ufunc(2.35, 48.85) == LAMBERT(2.35, 48.85)


@given(st.integers(1, 4), st.integers(1, 4), st.integers(1, 4))
def test_broadcasts_as_numpy_does(i, j, k):
    lon = np.linspace(0, 5, i).reshape(i, 1, 1)
    lat = np.linspace(44, 50, j).reshape(j, 1)
    z = np.linspace(0, 100, k)
    x, y, h = LAMBERT(lon, lat, z)
    assert x.shape == y.shape == h.shape == (i, j, k)
    full = LAMBERT(*(np.ascontiguousarray(a) for a in np.broadcast_arrays(lon, lat, z)))
    np.testing.assert_array_equal((x, y, h), full)


@given(st.integers(0, 700), st.integers(1, 5), st.booleans(), st.booleans())
def test_strides_change_nothing(count, step, backwards, interleaved):
    random = np.random.default_rng(count)
    lon, lat = random.uniform(0, 5, count), random.uniform(44, 50, count)
    expected = LAMBERT(lon, lat)
    if interleaved:
        table = np.full((count, 2 + step), np.nan)
        table[:, 0], table[:, 1] = lon, lat
        ins = table[:, 0], table[:, 1]
    else:
        wide = np.full((2, count * step), np.nan)
        wide[0, ::step], wide[1, ::step] = lon, lat
        ins = wide[0, ::step], wide[1, ::step]
    if backwards:
        ins = tuple(a[::-1] for a in ins)
        expected = tuple(a[::-1] for a in expected)
    np.testing.assert_array_equal(LAMBERT(*ins), expected)


def test_results_in_the_inputs_place():
    random = np.random.default_rng(7)
    points = np.column_stack([random.uniform(0, 5, 9001), random.uniform(44, 50, 9001)])
    expected = LAMBERT(points[:, 0].copy(), points[:, 1].copy())
    columns = points[:, 0], points[:, 1]
    result = LAMBERT(*columns, out=columns)
    assert result[0] is columns[0]
    np.testing.assert_array_equal(points[:, 0], expected[0])
    np.testing.assert_array_equal(points[:, 1], expected[1])
    # Crossed over, numpy makes the copy that this needs.
    lon, lat = random.uniform(0, 5, 9001), random.uniform(44, 50, 9001)
    expected = LAMBERT(lon, lat)
    LAMBERT(lon, lat, out=(lat, lon))
    np.testing.assert_array_equal((lat, lon), expected)


def test_where_leaves_the_others_alone():
    lon, lat = np.full(1000, 2.0), np.full(1000, 48.0)
    chosen = np.arange(1000) % 3 == 0
    out = np.full(1000, -7.0), np.full(1000, -8.0)
    LAMBERT(lon, lat, out=out, where=chosen)
    assert (out[0][~chosen] == -7).all() and (out[1][~chosen] == -8).all()
    np.testing.assert_array_equal(out[0][chosen], LAMBERT(2.0, 48.0)[0])
    lat[~chosen] = 99  # not looked at
    words = LAMBERT(lon, lat, where=chosen, errors="words")[2]
    assert (words == tidewater.SUCCESS).all()
    LAMBERT(lon, lat, where=chosen, errors="raise")


def test_single_precision(france):
    lon, lat = (a.astype(np.float32) for a in france)
    x, y = LAMBERT(lon, lat)
    assert x.dtype == y.dtype == np.float32
    fine = LAMBERT(lon.astype(float), lat.astype(float))
    np.testing.assert_array_equal(x, fine[0].astype(np.float32))
    np.testing.assert_array_equal(y, fine[1].astype(np.float32))
    assert LAMBERT(lon, lat.astype(float))[0].dtype == np.float64
    np.testing.assert_array_equal(LAMBERT(lon[::3], lat[::3])[0], x[::3])


def test_big_endian_and_unaligned(france):
    lon, lat = france
    expected = LAMBERT(lon, lat)
    np.testing.assert_array_equal(LAMBERT(lon.astype(">f8"), lat.astype(">f8")), expected)
    record = np.zeros(lon.size, np.dtype([("c", "u1"), ("lon", "<f8"), ("lat", "<f8")]))
    record["lon"], record["lat"] = lon, lat
    np.testing.assert_array_equal(LAMBERT(record["lon"], record["lat"]), expected)


def test_threads_give_the_same_figures():
    random = np.random.default_rng(8)
    lon, lat = random.uniform(0, 5, 100_003), random.uniform(44, 50, 100_003)
    lat[[0, 777, 99_999]] = 95
    one = LAMBERT(lon, lat, errors="words")
    for threads in (0, 2, 3, 8):
        np.testing.assert_array_equal(LAMBERT(lon, lat, errors="words", threads=threads), one)
    assert (np.flatnonzero(one[2] != tidewater.SUCCESS) == [0, 777, 99_999]).all()
    with pytest.raises(ValueError):
        LAMBERT(lon, lat, threads=-1)


def test_eight_threads_on_shared_objects(france):
    lon, lat = france
    t = Transformation("EPSG:4326", "EPSG:27572", operation="no shift")
    geodesic = tidewater.Geodesic()
    expected = np.array([*t(lon, lat), *t.inverse(*t(lon, lat)),
                         *geodesic.inverse(lon, lat, 2.0, 48.0)])
    failures = []

    def work():
        try:
            mine = Transformation("EPSG:4326", "EPSG:27572", operation="no shift")
            for way in (t, mine):
                there = way(lon, lat, threads=2)
                got = np.array([*there, *way.inverse(*there),
                                *geodesic.inverse(lon, lat, 2.0, 48.0)])
                np.testing.assert_array_equal(got, expected)
        except Exception as error:  # told by the test's own thread
            failures.append(error)

    threads = [threading.Thread(target=work) for _ in range(8)]
    for thread in threads:
        thread.start()
    for thread in threads:
        thread.join()
    assert not failures


def test_errors_of_points(recwarn):
    lon, lat = [2.0, 2.0, np.nan], [48.0, 95.0, 48.0]
    x, y = LAMBERT(lon, lat)
    assert np.isfinite(x[0]) and np.isnan(x[1:]).all() and np.isnan(y[1:]).all()
    x, y, words = LAMBERT(lon, lat, errors="words")
    assert words.dtype == np.uint32 and words[0] == tidewater.SUCCESS
    assert tidewater.status_text(int(words[1])) == "The latitude is out of range."
    with pytest.raises(PointError, match=r"Point \[1\]: The latitude is out of range\.") as error:
        LAMBERT(lon, lat, errors="raise")
    assert error.value.index == (1,) and error.value.word == words[1]
    with pytest.raises(PointError, match="^The latitude"):
        LAMBERT(2.0, 95.0, errors="raise")
    assert np.isnan(LAMBERT(2.0, 95.0)).all()
    with pytest.raises(ValueError, match="errors is"):
        LAMBERT(lon, lat, errors="ignore")
    assert len(recwarn) == 0


def test_wrong_calls():
    for arguments in ((), (1.0,), (1.0, 2.0, 3.0, 4.0), ("a", "b"), ([1, 2], [1, 2, 3])):
        with pytest.raises((TypeError, ValueError)):
            LAMBERT(*arguments)
    with pytest.raises(ValueError):
        LAMBERT([1.0], [2.0], out=(np.empty(1),))
    with pytest.raises(TypeError):
        LAMBERT(1.0, 2.0, thread=2)


def test_no_points():
    x, y = LAMBERT(np.empty(0), np.empty((3, 0)))
    assert x.shape == y.shape == (3, 0)


def test_what_it_tells():
    t = Transformation("EPSG:4277", "EPSG:4326", operation="EPSG:1314")
    assert t.operation == "EPSG:1314" and t.accuracy > 0
    assert "Lambert" in LAMBERT.describe()
    assert t.inverse.inverse(1.0, 52.0) == t(1.0, 52.0)
    assert t.inverse.source == t.target
    assert any(c.operation == "EPSG:1314" for c in Transformation.candidates(4277, 4326))
    with pytest.raises(tidewater.Error, match="99999"):
        Transformation("EPSG:99999", "EPSG:4326")


def test_options():
    own = Transformation("EPSG:4326", "EPSG:2154", own_axes=True)
    assert own(48.85, 2.35) == LAMBERT(2.35, 48.85)
    radians = Transformation("EPSG:4326", "EPSG:2154", radians=True)
    assert radians(np.radians(2.35), np.radians(48.85)) == pytest.approx(
        LAMBERT(2.35, 48.85), abs=1e-8)


def test_pickles():
    for t in (LAMBERT, LAMBERT.inverse, Transformation(4326, "utm:31N", radians=True)):
        again = pickle.loads(pickle.dumps(t))
        assert again(1.0, 0.8) == pytest.approx(t(1.0, 0.8), nan_ok=True)
        assert again.target == t.target


def test_systems():
    system = System("EPSG:2154")
    assert (system.code, system.kind, system.unit) == (2154, "projected", "metre")
    assert system.name == "RGF93 v1 / Lambert-93"
    assert system.ellipsoid.a == 6378137
    assert System(2154) == System("2154") == System(system)
    assert pyproj.CRS(system.to_wkt()).to_epsg() == 2154
    assert System(pyproj.CRS("EPSG:2154")).parameters == system.parameters
    assert System("utm", at=(2.35, 48.85)).name == System("utm:31N").name
    assert tidewater.System.search("lambert-93")[0].code == 2154
    with pytest.raises(tidewater.Error):
        System("no such place")
    assert issubclass(tidewater.Error, ValueError)


def test_the_ufunc_outlives_its_maker():
    ufunc = Transformation("EPSG:4326", "EPSG:32631").ufunc
    np.testing.assert_allclose(ufunc(3.0, 0.0), (500000, 0), atol=1e-6)


def test_brings_all_it_needs(tmp_path):
    # An installed package finds store and libraries without any variable, from any folder.
    code = ("import tidewater as t, re; t.System('EPSG:2154');"
            "maps = open('/proc/self/maps').read();"
            "print(all('/tidewater/lib' in path for path in re.findall("
            "r'\\S+lib(?:tidewater|tabdll|tiff)\\S*', maps)))")
    environment = {name: value for name, value in os.environ.items()
                   if name not in ("TIDEWATER_STORE", "LD_LIBRARY_PATH")}
    done = subprocess.run([sys.executable, "-c", code], cwd=tmp_path, env=environment,
                          capture_output=True, text=True, check=True)
    assert done.stdout.strip() == "True"
