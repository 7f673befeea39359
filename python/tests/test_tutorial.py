"""The tutorial runs as it stands, and its pictures show something."""

import pathlib
import runpy

import numpy as np
import pytest

pytest.importorskip("matplotlib")

TUTORIAL = pathlib.Path(__file__).parents[1] / "examples" / "tutorial.py"


def test_tutorial(tmp_path, capsys, grid_folder):
    from matplotlib import image

    runpy.run_path(str(TUTORIAL))["main"](tmp_path)
    assert "The latitude is out of range." in capsys.readouterr().out
    for name in ("tissot", "distortion", "shifts", "declination"):
        pixels = image.imread(tmp_path / f"{name}.png")[..., :3]
        assert pixels.shape[0] > 300 and pixels.shape[1] > 400
        # Not blank: at least a fiftieth is not white.
        assert np.mean(pixels.min(axis=2) < 0.95) > 0.02
