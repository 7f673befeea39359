"""A transformer with pyproj's call signature."""

from __future__ import annotations

import enum
from typing import Any, Dict, Iterable, Iterator, Optional, Union

import numpy as np

from . import _core
from ._call import PointError
from ._systems import System, Transformation


class TransformDirection(str, enum.Enum):
    """Which way `Transformer.transform` goes."""

    FORWARD = "FORWARD"
    INVERSE = "INVERSE"
    IDENT = "IDENT"


class Transformer:
    """Takes the place of ``pyproj.Transformer`` where ``from_crs`` made it.

    What differs:

    - One operation is chosen when the transformer is made, for the area of interest or for where
      both systems are in use; it does not change from point to point.
    - Without a usable operation between two datums construction fails with a sentence instead of
      leaving positions as they are; ``allow_ballpark=True`` leaves them.
    - `tt` is refused: give ``epoch`` to ``from_crs``.
    - ``from_pipeline`` and ``from_proj`` pipelines are not supported.
    - Systems may be anything that `tidewater.System` takes; grids come from the same folders.
    """

    def __init__(self, source: System, target: System, always_xy: bool, **options: Any) -> None:
        self._source, self._target = source, target
        self._options: Dict[str, Any] = {**options, "own_axes": not always_xy}
        self._degrees = Transformation(source, target, **self._options)
        self._radians: Optional[Transformation] = None

    @classmethod
    def from_crs(cls, crs_from: Any, crs_to: Any, always_xy: bool = False,
                 area_of_interest: Any = None, authority: Optional[str] = None,
                 accuracy: Optional[float] = None, allow_ballpark: Optional[bool] = None, *,
                 epoch: Optional[float] = None, operation: str = "") -> "Transformer":
        """From two systems.

        Parameters
        ----------
        crs_from, crs_to : what `tidewater.System` takes, or an object with ``to_wkt``
        always_xy : bool
            Longitude or easting first; else the systems' own axis order.
        area_of_interest : optional
            (west, south, east, north) in degrees, or an object with attributes
            ``west_lon_degree`` and so on.
        authority : str, optional
            Only ``"EPSG"`` can be asked for.
        accuracy : float, optional
            Least accuracy in metres that the operation must state.
        allow_ballpark : bool, optional
            True: positions stay as they are where no operation can be used.
        epoch, operation
            As in `Transformation`.
        """
        if authority not in (None, "", "EPSG", "any"):
            raise _core.Error(f'The registry has operations of "EPSG", none of "{authority}".')
        if area_of_interest is not None and hasattr(area_of_interest, "west_lon_degree"):
            a = area_of_interest
            area_of_interest = (a.west_lon_degree, a.south_lat_degree, a.east_lon_degree,
                                a.north_lat_degree)
        options = {"area": area_of_interest, "epoch": epoch, "operation": operation}
        source, target = System(crs_from), System(crs_to)
        try:
            made = cls(source, target, always_xy, **options)
        except _core.Error:
            if not allow_ballpark:
                raise
            made = cls(source, target, always_xy, **{**options, "operation": "no shift"})
        if accuracy is not None and not made._degrees.accuracy <= accuracy:
            raise _core.Error(
                f"The best operation from {source.name} to {target.name} is good to "
                f"{made._degrees.accuracy:g} m, not to {accuracy:g} m.")
        return made

    @classmethod
    def from_pipeline(cls, pipeline: str) -> "Transformer":
        """Not supported; raises `tidewater.Error`."""
        raise _core.Error("Pipelines are not supported: make a Transformer from two systems.")

    @property
    def source_crs(self) -> System:
        return self._source

    @property
    def target_crs(self) -> System:
        return self._target

    @property
    def accuracy(self) -> float:
        """Metres; -1 where it is not known."""
        known = self._degrees.accuracy
        return known if known == known else -1

    @property
    def description(self) -> str:
        """The steps in words."""
        return self._degrees.describe()

    def _way(self, radians: bool, direction: Any) -> Optional[Transformation]:
        direction = TransformDirection(str(getattr(direction, "value", direction)).upper())
        if direction is TransformDirection.IDENT:
            return None
        way = self._degrees
        if radians:
            if self._radians is None:
                self._radians = Transformation(self._source, self._target, radians=True,
                                               **self._options)
            way = self._radians
        return way if direction is TransformDirection.FORWARD else way.inverse

    def transform(self, xx: Any, yy: Any, zz: Any = None, tt: Any = None, radians: bool = False,
                  errcheck: bool = False,
                  direction: Union[str, TransformDirection] = TransformDirection.FORWARD,
                  inplace: bool = False) -> tuple:
        """Transforms points; a point that fails becomes infinite, as in pyproj.

        Parameters
        ----------
        xx, yy, zz : numbers, lists, tuples or arrays
            Results are of the same kind.
        tt
            Not supported.
        radians : bool
            Geographic coordinates in radians.
        errcheck : bool
            Raises `tidewater.PointError` for the first point that fails.
        direction : {"FORWARD", "INVERSE", "IDENT"}
        inplace : bool
            Results go into the arrays that are given, where those are of float64.
        """
        if tt is not None:
            raise _core.Error("A time for each point is not supported: give epoch to from_crs.")
        if zz is None and direction is TransformDirection.FORWARD and not radians \
                and type(xx) is float and type(yy) is float:
            x, y = self._degrees(xx, yy)
            if x == x:
                return x, y
            if errcheck:
                self._degrees(xx, yy, errors="raise")
            return np.inf, np.inf
        given = (xx, yy) if zz is None else (xx, yy, zz)
        way = self._way(radians, direction)
        if way is None:
            return given
        values = [np.asarray(value, dtype=float) for value in given]
        keep = inplace and all(value is one for value, one in zip(values, given))
        result = way(*values, errors="raise" if errcheck else "nan",
                     out=tuple(values) if keep else None)
        failed = np.isnan(result[0])
        if np.any(failed):
            result = tuple(np.where(failed, np.inf, column) for column in result)
            if keep:
                for value, column in zip(values, result):
                    value[...] = column
                result = tuple(values)
        return tuple(_as_given(column, one) for column, one in zip(result, given))

    def itransform(self, points: Iterable, switch: bool = False, time_3rd: bool = False,
                   radians: bool = False, errcheck: bool = False,
                   direction: Union[str, TransformDirection] = TransformDirection.FORWARD
                   ) -> Iterator[tuple]:
        """Transforms an iterable of tuples, one tuple a point."""
        if time_3rd:
            raise _core.Error("A time for each point is not supported: give epoch to from_crs.")
        points = [tuple(point) for point in points]
        if not points:
            return
        columns = [np.array(column, float) for column in zip(*points)]
        if switch:
            columns[:2] = columns[1::-1]
        zz = columns[2] if len(columns) > 2 else None
        for row in zip(*self.transform(columns[0], columns[1], zz, radians=radians,
                                       errcheck=errcheck, direction=direction)):
            yield tuple(float(value) for value in row)


def _as_given(result: Any, given: Any) -> Any:
    if isinstance(given, (list, tuple)):
        return type(given)(np.asarray(result).tolist())
    if np.ndim(given) == 0 and not isinstance(given, np.ndarray):
        return float(result)
    return result
