"""Fifty million points over a cluster, and the same from a table in many files.

    python cluster.py [points]

Starts two worker processes on the loopback interface, transforms an array of points that is never
whole in memory and a table of CSV files, and holds the sums against one process.
"""

import pathlib
import sys
import tempfile
import time

import dask.array as da
import dask.dataframe as dd
import numpy as np
import pandas as pd
from distributed import Client, LocalCluster

import tidewater

CHUNK = 1_000_000
MIDDLE = np.array([700_000.0, 6_600_000.0])  # sums are taken from here, and stay small


def made(count, seed=0):
    """Longitudes and latitudes in France: the same for each chunk, wherever it is made."""
    random = np.random.default_rng(seed)
    return random.uniform(-4, 8, count), random.uniform(42, 51, count)


def chunk_of_points(block_info=None):
    start, stop = block_info[None]["array-location"][1]
    return np.stack(made(stop - start, seed=start))


def partition(table):
    """What a worker does with one file of the table."""
    transformation = tidewater.Transformation("EPSG:4326", "EPSG:2154")
    x, y = transformation(table.lon, table.lat)
    return table.assign(x=x, y=y)


def times_made():
    """How often this worker has made the transformation that came with the chunks."""
    from tidewater import _systems

    return _systems._again.cache_info().misses


def main(count=50_000_000, folder=None, rows=1_000_000):
    """Runs both, and gives sums of one process and of the cluster with what they may differ by."""
    transformation = tidewater.Transformation("EPSG:4326", "EPSG:2154")
    sums, times = {}, {}
    folder = pathlib.Path(folder or tempfile.mkdtemp())

    # One process, a chunk after another.
    begun = time.perf_counter()
    total = np.zeros(2)
    for start in range(0, count, CHUNK):
        x, y = transformation(*made(min(CHUNK, count - start), seed=start))
        total += (x - MIDDLE[0]).sum(), (y - MIDDLE[1]).sum()
    times["one process"] = time.perf_counter() - begun

    files = 8
    lon, lat = made(rows)
    for number, part in enumerate(np.array_split(np.arange(rows), files)):
        pd.DataFrame({"lon": lon[part], "lat": lat[part]}).to_csv(
            folder / f"points-{number}.csv", index=False)
    x, y = transformation(lon, lat)
    table_total = (x - MIDDLE[0]).sum(), (y - MIDDLE[1]).sum()

    with LocalCluster(n_workers=2, threads_per_worker=1, host="127.0.0.1",
                      dashboard_address=None, local_directory=str(folder)) as cluster, \
            Client(cluster) as client:
        begun = time.perf_counter()
        sizes = (CHUNK,) * (count // CHUNK) + ((count % CHUNK,) if count % CHUNK else ())
        points = da.map_blocks(chunk_of_points, chunks=((2,), sizes), dtype=float,
                               meta=np.empty((0, 0)))
        # The call is the one that takes numpy arrays; here it gives arrays that are not made yet.
        x, y, words = transformation(points[0], points[1], errors="words")
        failed = (words != tidewater.SUCCESS).sum()
        result = da.compute((x - MIDDLE[0]).sum(), (y - MIDDLE[1]).sum(), failed)
        times["array on two workers"] = time.perf_counter() - begun
        begun = time.perf_counter()
        table = dd.read_csv(str(folder / "points-*.csv"))
        moved = table.map_partitions(
            partition, meta={"lon": float, "lat": float, "x": float, "y": float})
        table_result = da.compute((moved.x - MIDDLE[0]).sum(), (moved.y - MIDDLE[1]).sum())
        times["table on two workers"] = time.perf_counter() - begun
        workers = len(client.scheduler_info()["workers"])
        makings = client.run(times_made)

    # Figures are good to a nanometre; their sums differ by less, for they go up and down.
    for name, one, many, number in (("array", total, result[:2], count),
                                    ("table", table_total, table_result, rows)):
        for axis, a, b in zip("xy", one, many):
            sums[f"{name} {axis}"] = (a, float(b), 1e-10 * number)
    return {"sums": sums, "times": times, "workers": workers, "failed": int(result[2]),
            "makings": list(makings.values())}


if __name__ == "__main__":
    points = int(sys.argv[1]) if len(sys.argv) > 1 else 50_000_000
    report = main(points)
    for name, (one, many, _) in report["sums"].items():
        print(f"{name}: {one:.6f} m in one process, {many:.6f} m on the cluster")
    for name, seconds in report["times"].items():
        print(f"{name}: {seconds:.2f} s")
