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
        A point that fails becomes not-a-number, or raises `tidewater.PointError`.
    **options
        As `Transformation` takes them, such as ``operation`` or ``area``.

    Returns
    -------
    a new object of the same kind; its ``crs`` is the target's.
    """
    import shapely

    if errors not in ("nan", "raise"):
        raise ValueError('errors is "nan" or "raise" for geometries.')
    if frame.crs is None:
        raise ValueError("The frame has no system; set its crs first.")
    system = System(target)
    transformation = Transformation(System(frame.crs), system, **options)
    geometries = np.asarray(frame.geometry.values)
    has_z = shapely.has_z(geometries)
    moved = geometries.copy()
    for flag in (False, True):
        chosen = has_z == flag
        if not chosen.any():
            continue
        points = shapely.get_coordinates(geometries[chosen], include_z=flag)
        columns = tuple(points[:, k] for k in range(points.shape[1]))
        transformation(*columns, out=columns, threads=threads, errors=errors)
        moved[chosen] = shapely.set_coordinates(geometries[chosen].copy(), points)
    crs = f"EPSG:{system.code}" if system.code else system.to_wkt()
    result = frame.copy()
    values = type(frame.geometry.values)(moved, crs=crs)
    if isinstance(frame, pd.DataFrame):
        result = result.set_geometry(values)
        return result if frame.geometry.name == result.geometry.name else \
            result.rename_geometry(frame.geometry.name)
    return type(frame)(values, index=frame.index, name=frame.name)


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
