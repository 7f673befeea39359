import os
import pathlib

import numpy as np
import pytest
from hypothesis import HealthCheck, settings

# Timings of a busy machine are no failures.
settings.register_profile("quick", deadline=None, max_examples=60,
                          suppress_health_check=[HealthCheck.too_slow])
settings.load_profile("quick")

GRIDS = pathlib.Path("/usr/share/proj")


@pytest.fixture(scope="session")
def grid_folder():
    """Grids that Debian's proj-data brings."""
    if not (GRIDS / "ntf_r93.gsb").exists():
        pytest.skip("the grids of proj-data are not installed")
    return GRIDS


@pytest.fixture
def france():
    """Points in France: longitudes and latitudes."""
    random = np.random.default_rng(2154)
    return random.uniform(-4, 8, 20000), random.uniform(42, 51, 20000)
