"""pandas and GeoPandas: whole geometries, and text in columns.

Importing this module gives every `pandas.Series` the accessor ``tidewater``.
"""

from __future__ import annotations

from typing import Any

import numpy as np
import pandas as pd

from . import _text
from ._systems import System, Transformation


def to_system(frame: Any, target: Any, *, threads: int = 0, errors: str = "nan",
              **options: Any) -> Any:
    """A GeoDataFrame or GeoSeries in another system; takes the place of ``to_crs``.

    Parameters
    ----------
    frame : geopandas.GeoDataFrame or geopandas.GeoSeries
        With its system set; heights of its geometries are transformed with them.
    target : what `tidewater.System` takes
    threads : int
        How many at most; 0 for all cores.
    errors : {"nan", "raise"}
        A point that fails becomes NaN, or raises `tidewater.PointError`.
    **options
        As `Transformation` takes them, such as ``operation`` or ``area``.

    Returns
    -------
    a new object of the same kind; its ``crs`` is the target's.
    """
    if errors not in ("nan", "raise"):
        raise ValueError('errors is "nan" or "raise" for geometries.')
    if frame.crs is None:
        raise ValueError("The frame has no system; set its crs first.")
    system = System(target)
    transformation = Transformation(System(frame.crs), system, **options)
    moved = _moved(np.asarray(frame.geometry.values, dtype=object),
                   lambda *columns: transformation(*columns, threads=threads, errors=errors))
    crs = f"EPSG:{system.code}" if system.code else system.to_wkt()
    values = type(frame.geometry.values)(moved, crs=crs)
    if isinstance(frame, pd.DataFrame):
        return frame.set_geometry(values)
    return type(frame)(values, index=frame.index, name=frame.name)


def _moved(geometries: np.ndarray, transform: Any) -> np.ndarray:
    """The geometries with all their points through one call of each number of axes."""
    from shapely.ops import transform as each

    calls: list = []  # the columns of each ring, line or point, in order

    def gather(*columns: Any) -> Any:
        calls.append(columns)
        return columns

    for geometry in geometries:
        if geometry is not None:
            each(gather, geometry)
    results: list = [None] * len(calls)
    for axes in (2, 3):
        chosen = [i for i, columns in enumerate(calls) if len(columns) == axes]
        if not chosen:
            continue
        sizes = [len(calls[i][0]) if np.ndim(calls[i][0]) else 1 for i in chosen]
        whole = transform(*(np.concatenate([np.atleast_1d(calls[i][k]) for i in chosen])
                            for k in range(axes)))
        ends = np.cumsum(sizes)
        for i, end, size in zip(chosen, ends, sizes):
            piece = [column[end - size:end].tolist() for column in whole]
            results[i] = tuple(piece) if np.ndim(calls[i][0]) else tuple(c[0] for c in piece)
    replay = iter(results)
    moved = np.empty(len(geometries), dtype=object)
    for i, geometry in enumerate(geometries):
        moved[i] = None if geometry is None else each(lambda *_: next(replay), geometry)
    return moved


@pd.api.extensions.register_series_accessor("tidewater")
class SeriesAccessor:
    """What `pandas.Series` can do with coordinates: ``series.tidewater.parse()``."""

    def __init__(self, series: pd.Series) -> None:
        self._series = series

    def _like(self, values: Any) -> pd.Series:
        return pd.Series(values, index=self._series.index, name=self._series.name)

    def parse(self, axis: Any = None, **keywords: Any) -> pd.Series:
        """Angles in text to degrees; as `tidewater.parse`."""
        return self._like(_text.parse(self._series.to_numpy(object), axis, **keywords))

    def format(self, form: str = "degrees", **keywords: Any) -> pd.Series:
        """Degrees to text; as `tidewater.format`."""
        return self._like(_text.format(self._series.to_numpy(float), form, **keywords))

    def parse_position(self, order: Any = None, **keywords: Any) -> pd.DataFrame:
        """Positions in text to columns lon, lat and height."""
        lon, lat, height = _text.parse_position(
            self._series.to_numpy(object), order, **keywords)
        return pd.DataFrame({"lon": lon, "lat": lat, "height": height}, index=self._series.index)

    def transform(self, y: pd.Series, source: Any, target: Any, **options: Any) -> pd.DataFrame:
        """This series as x, with `y`, from one system to another: columns x and y."""
        columns = Transformation(source, target, **options)(
            self._series.to_numpy(float), y.to_numpy(float))
        return pd.DataFrame({"x": columns[0], "y": columns[1]}, index=self._series.index)

    def to_system(self, target: Any, **keywords: Any) -> Any:
        """A series of geometries in another system; as `to_system`."""
        return to_system(self._series, target, **keywords)
