"""A cluster of worker processes on the loopback interface, against one process."""

import os
import pathlib
import runpy

import numpy as np
import pytest

pytest.importorskip("dask.dataframe")
pytest.importorskip("distributed")

POINTS = int(os.environ.get("TIDEWATER_CLUSTER_POINTS", 2_000_000))
EXAMPLE = pathlib.Path(__file__).parents[1] / "examples" / "cluster.py"


def test_cluster(tmp_path):
    example = runpy.run_path(str(EXAMPLE))
    report = example["main"](POINTS, tmp_path, rows=min(POINTS, 200_000))
    # Sums are of metres from a point in the middle; they are added in another order.
    for name, (one, many, tolerance) in report["sums"].items():
        np.testing.assert_allclose(many, one, rtol=0, atol=tolerance, err_msg=name)
    assert report["workers"] == 2 and report["failed"] == 0
    # A worker makes the transformation once, whatever the number of chunks that bring it along.
    assert report["makings"] == [1, 1]
