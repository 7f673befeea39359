"""Tidewater beside pyproj on one core: medians of thread time, both in turn, in one process."""

import statistics
import time

import numpy as np
import pyproj

import tidewater

ROUNDS = 7
random = np.random.default_rng(2154)


def beside(ours, theirs, per):
    """Nanoseconds of processor time for each of `per` points, ours and theirs."""
    times = [], []
    for _ in range(ROUNDS):
        for call, list_ in ((ours, times[0]), (theirs, times[1])):
            begun = time.thread_time_ns()
            call()
            list_.append((time.thread_time_ns() - begun) / per)
    return statistics.median(times[0]), statistics.median(times[1])


def row(name, ours, theirs, per, difference):
    one, other = beside(ours, theirs, per)
    print(f"| {name} | {one:,.0f} | {other:,.0f} | {other / one:.1f} | {difference:.1e} |")


def repeated(call, count):
    def run():
        for _ in range(count):
            call()
    return run


def main():
    print(f"tidewater {tidewater.__version__}, pyproj {pyproj.__version__} on PROJ "
          f"{pyproj.proj_version_str}, numpy {np.__version__}; one core\n")
    print("| | ns a point | pyproj | times | worst difference, m |")
    print("|---|---:|---:|---:|---:|")
    count = 1_000_000
    lon, lat = random.uniform(-1, 7, count), random.uniform(43, 50, count)
    for source, target in ((32631, 32632), (32631, 3857), (3857, 3395), (32631, 2154),
                           (2154, 3857), (2154, 3035), (2154, 27572)):
        ours = tidewater.Transformation(source, target, operation="no shift")
        theirs = pyproj.Transformer.from_crs(source, target, always_xy=True)
        x, y = tidewater.Transformation(4326, source, operation="no shift")(lon, lat)
        if pyproj.CRS(source).ellipsoid != pyproj.CRS(target).ellipsoid:
            ours = tidewater.Transformation(source, target)
        difference = max(np.abs(np.subtract(a, b)).max()
                         for a, b in zip(ours(x, y), theirs.transform(x, y)))
        row(f"a million points, EPSG:{source} to EPSG:{target}", lambda: ours(x, y),
            lambda: theirs.transform(x, y), count, difference)

    for target in (32631, 2154, 3857):
        ours = tidewater.Transformation(4326, target)
        theirs = pyproj.Transformer.from_crs(4326, target, always_xy=True)
        one, other = ours(2.35, 48.85), theirs.transform(2.35, 48.85)
        row(f"one point, EPSG:4326 to EPSG:{target}", repeated(lambda: ours(2.35, 48.85), 20000),
            repeated(lambda: theirs.transform(2.35, 48.85), 20000), 20000,
            max(abs(a - b) for a, b in zip(one, other)))
    alike = tidewater.Transformer.from_crs(4326, 32631, always_xy=True)
    theirs = pyproj.Transformer.from_crs(4326, 32631, always_xy=True)
    row("one point by Transformer.transform", repeated(lambda: alike.transform(2.35, 48.85), 20000),
        repeated(lambda: theirs.transform(2.35, 48.85), 20000), 20000,
        max(abs(a - b) for a, b in zip(alike.transform(2.35, 48.85),
                                       theirs.transform(2.35, 48.85))))

    count = 100_000
    pairs = [random.uniform(-180, 180, count), random.uniform(-90, 90, count),
             random.uniform(-180, 180, count), random.uniform(-90, 90, count)]
    ours, theirs = tidewater.Geodesic(), pyproj.Geod(ellps="WGS84")
    lengths = ours.inverse(*pairs)[0]
    row("geodesic inverse", lambda: ours.inverse(*pairs), lambda: theirs.inv(*pairs), count,
        np.abs(lengths - theirs.inv(*pairs)[2]).max())
    azimuth = random.uniform(-180, 180, count)
    ends = ours.direct(pairs[0], pairs[1], azimuth, lengths)
    others = theirs.fwd(pairs[0], pairs[1], azimuth, lengths)
    row("geodesic direct", lambda: ours.direct(pairs[0], pairs[1], azimuth, lengths),
        lambda: theirs.fwd(pairs[0], pairs[1], azimuth, lengths), count,
        np.abs(ends.lat - others[1]).max() * 111_000)
    row("one geodesic", repeated(lambda: ours.inverse(-74.0, 40.7, 2.35, 48.85), 20000),
        repeated(lambda: theirs.inv(-74.0, 40.7, 2.35, 48.85), 20000), 20000, 0)

    print(f"\nOn all cores a million points EPSG:32631 to EPSG:32632 take "
          f"{wall_time(count=1_000_000):.1f} ms.")


def wall_time(count):
    t = tidewater.Transformation(32631, 32632)
    x, y = random.uniform(3e5, 7e5, count), random.uniform(4.8e6, 5.5e6, count)
    out = np.empty(count), np.empty(count)
    times = []
    for _ in range(ROUNDS):
        begun = time.perf_counter()
        t(x, y, out=out, threads=0)
        times.append(time.perf_counter() - begun)
    return 1e3 * statistics.median(times)


if __name__ == "__main__":
    main()
