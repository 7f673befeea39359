"""Geodesics and rhumb lines."""

from __future__ import annotations

from typing import TYPE_CHECKING, Any, NamedTuple, Optional, Union

import numpy as np

from . import _core
from ._call import Array, Ufuncs, run, with_keywords
from ._systems import Ellipsoid


class Course(NamedTuple):
    """Lines between points: metres, and degrees clockwise from north, going on at the end."""

    length: Any
    azimuth1: Any
    azimuth2: Any


class End(NamedTuple):
    """Where lines end: degrees."""

    lon: Any
    lat: Any
    azimuth: Any


class Polygon(NamedTuple):
    """What a polygon measures: metres and square metres, counterclockwise positive."""

    perimeter: float
    area: float


if TYPE_CHECKING:
    _Native = _core._Lines
else:
    _Native = object


class _Lines(_Native):
    def __init__(self, ellipsoid: Union[str, Ellipsoid] = "WGS 84", *,
                 a: Optional[float] = None, f: Optional[float] = None) -> None:
        if a is None:
            if not isinstance(ellipsoid, Ellipsoid):
                ellipsoid = Ellipsoid(ellipsoid)
            a, f = ellipsoid.a, ellipsoid.flattening
        super().__init__(float(a), float(f or 0))
        self._inverses = Ufuncs(self._inverse_ufunc)
        self._directs = Ufuncs(self._direct_ufunc)

    @with_keywords
    def _inverse(self, lon1: Array, lat1: Array, lon2: Array, lat2: Array, *, area: bool = False,
                 **keywords: Any) -> Any:
        """The lines between points, which broadcast.

        Parameters
        ----------
        lon1, lat1, lon2, lat2 : array_like
            Degrees.
        area : bool
            Gives the area between each line and the equator in square metres as well.
        %KEYWORDS%

        Returns
        -------
        Course
            Length in metres and azimuths in degrees at both ends; a longer plain tuple with the
            area or the words.
        """
        result = run(self.inverse, lambda words: self._inverses(area, words),
                     (lon1, lat1, lon2, lat2), **keywords)
        return Course(*result) if len(result) == 3 else result

    @with_keywords
    def _direct(self, lon: Array, lat: Array, azimuth: Array, length: Array, *,
                area: bool = False, **keywords: Any) -> Any:
        """Where lines lead.

        Parameters
        ----------
        lon, lat, azimuth : array_like
            Degrees.
        length : array_like
            Metres, negative for the way behind.
        area : bool
            As in `inverse`.
        %KEYWORDS%

        Returns
        -------
        End
            Longitudes, latitudes and azimuths in degrees; a longer plain tuple with the area or
            the words.
        """
        result = run(self.direct, lambda words: self._directs(area, words),
                     (lon, lat, azimuth, length), **keywords)
        return End(*result) if len(result) == 3 else result

    def points(self, lon1: Array, lat1: Array, lon2: Array, lat2: Array, count: int) -> End:
        """Points at even distances along lines, ends included.

        Parameters
        ----------
        lon1, lat1, lon2, lat2 : array_like
            Degrees; they broadcast.
        count : int
            Points of each line, at least 2; they make the last axis of the results.
        """
        if count < 2:
            raise ValueError("A line has at least its two ends.")
        lon1, lat1, lon2, lat2 = (
            np.asarray(value, float)[..., np.newaxis] for value in (lon1, lat1, lon2, lat2)
        )
        course = self._inverse(lon1, lat1, lon2, lat2)
        part = np.linspace(0, 1, count)
        return self._direct(lon1, lat1, course.azimuth1, course.length * part)

    def polygon(self, lon: Array, lat: Array) -> Polygon:
        """Perimeter and area of a ring; the last vertex is joined to the first.

        Parameters
        ----------
        lon, lat : array_like of one axis
            Degrees.
        """
        lon, lat = np.asarray(lon, float), np.asarray(lat, float)
        if lon.ndim != 1 or lon.shape != lat.shape:
            raise ValueError("A ring has as many longitudes as latitudes, along one axis.")
        return Polygon(*self._polygon(lon, lat))

    def __reduce__(self):
        return _line_maker, (type(self), self.a, self.f)

    def __repr__(self) -> str:
        return f"{type(self).__name__}(a={self.a!r}, f={self.f!r})"


def _line_maker(kind: type, a: float, f: float) -> Any:
    return kind(a=a, f=f)


class Geodesic(_Lines, _core.Geodesic):
    """Shortest lines on an ellipsoid.

    Parameters
    ----------
    ellipsoid : str or Ellipsoid
    a, f : float, optional
        Semi-major axis in metres and flattening instead.

    Examples
    --------
    >>> length, there, back = Geodesic().inverse(-74.0, 40.7, 2.35, 48.85)
    >>> round(length)
    5853101
    """


class Rhumb(_Lines, _core.Rhumb):
    """Lines of constant azimuth on an ellipsoid; otherwise as `Geodesic`."""
