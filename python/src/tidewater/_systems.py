"""Coordinate systems, transformations between them, and map projections."""

from __future__ import annotations

import functools
from typing import Any, Mapping, NamedTuple, Optional, Sequence, Tuple, Union

import numpy as np

from . import _core
from ._call import Array, Ufuncs, run, with_keywords

Ellipsoid = _core.Ellipsoid

Bounds = Tuple[float, float, float, float]
"""West, south, east, north in degrees; west is greater than east across the 180th meridian."""


class FoundSystem(NamedTuple):
    """What a search found."""

    code: int
    name: str
    kind: str


class System(_core.System):
    """A coordinate system.

    Parameters
    ----------
    text : str, int, System, or an object with ``to_wkt``
        A registry code (``"EPSG:2154"``, ``2154``, ``"EPSG:2154+5720"``), a short name
        (``"wgs84"``, ``"utm:30N"``, ``"web mercator"``), a registry name, a definition
        (``"lambert conformal lat1=44 lat2=49 ..."``), a PROJ string or WKT.
    at : (float, float), optional
        Longitude and latitude in degrees, from which ``"utm"`` and ``"ups"`` find their zone.

    Raises
    ------
    tidewater.Error
        With one sentence that names what was asked and what there is.
    """

    def __init__(self, text: Any, at: Optional[Tuple[float, float]] = None) -> None:
        self._made_from: Tuple[str, Optional[Tuple[float, float]]]
        if isinstance(text, System):
            text, at = text._made_from
        elif hasattr(text, "to_wkt"):
            text = text.to_wkt()
        text = str(text)
        if at is None:
            super().__init__(text)
        else:
            super().__init__(text, float(at[0]), float(at[1]))
        self._made_from = (text, at)

    @property
    def projection(self) -> Optional["Projection"]:
        """Projection of a projected system, without its unit; `None` for others."""
        native = self._projection()
        return None if native is None else Projection._around(native, (_of_system, (self,)))

    @staticmethod
    def search(words: str, limit: int = 20) -> "list[FoundSystem]":
        """Systems whose names have these words, without regard to case and accents."""
        return [FoundSystem(*found) for found in _core.System.search(words, limit)]

    def __reduce__(self):
        return System, self._made_from

    def __eq__(self, other: object) -> bool:
        return isinstance(other, System) and self._identity == other._identity

    def __hash__(self) -> int:
        return hash(self._identity)

    @property
    def _identity(self) -> Any:
        return self.code or self._made_from

    def __repr__(self) -> str:
        text, at = self._made_from
        return f"System({text!r})" if at is None else f"System({text!r}, at={at!r})"

    def __str__(self) -> str:
        return self.name


def _of_system(system: System) -> Optional["Projection"]:
    return system.projection


# A worker that is sent the same object with every piece of an array makes it once.
@functools.lru_cache(maxsize=64)
def _again(kind: Any, key: tuple) -> Any:
    return kind._from_key(key)


class Candidate(NamedTuple):
    """An operation that could serve between two systems."""

    operation: str
    name: str
    accuracy: float
    area: Bounds
    missing: str


class Transformation(_core.Transformation):
    """The way from one coordinate system to another; call it with coordinates.

    Longitude or easting first, degrees and metres (or the system's own unit) whatever the
    registry's axis order.

    Parameters
    ----------
    source, target : System or what `System` takes
    operation : str
        The datum step: empty for the registry's best, ``"EPSG:1671"`` for one that is named,
        ``"grid:file.gsb"`` for a grid file, ``"no shift"`` for none.
    grid_folders : sequence of str
        Where grids are looked for before the usual places.
    epoch : float, optional
        Coordinate epoch in decimal years, for operations that depend on time.
    area : (west, south, east, north), optional
        Where the points lie, degrees; it decides which operation is best.
    radians : bool
        Geographic coordinates in radians.
    own_axes : bool
        Axes in the systems' own order.

    Raises
    ------
    tidewater.Error
        Where no operation is known or can be used; the sentence names the grids that are missing.

    Examples
    --------
    >>> t = Transformation("EPSG:4326", "EPSG:2154")
    >>> x, y = t(2.35, 48.85)
    >>> print(f"{x:.3f} {y:.3f}")
    652303.297 6861273.297
    """

    def __init__(
        self,
        source: Any,
        target: Any,
        *,
        operation: str = "",
        grid_folders: Sequence[str] = (),
        epoch: Optional[float] = None,
        area: Optional[Bounds] = None,
        radians: bool = False,
        own_axes: bool = False,
    ) -> None:
        source = source if isinstance(source, System) else System(source)
        target = target if isinstance(target, System) else System(target)
        folders = tuple(str(folder) for folder in grid_folders)
        bounds = None if area is None else tuple(float(bound) for bound in area)
        options = (operation, folders, epoch, bounds, radians, own_axes)
        super().__init__(source, target, operation, list(folders), epoch, bounds, radians, own_axes)
        self._settle(source, target, (source, target, options, False))

    def _settle(self, source: System, target: System, key: tuple) -> None:
        self.source = source
        self.target = target
        self._key = key
        self._ufuncs = Ufuncs(self._ufunc)

    @classmethod
    def _from_key(cls, key: tuple) -> "Transformation":
        source, target, (operation, folders, epoch, area, radians, own_axes), back = key
        made = cls(source, target, operation=operation, grid_folders=folders, epoch=epoch,
                   area=area, radians=radians, own_axes=own_axes)
        return made.inverse if back else made

    @functools.cached_property
    def inverse(self) -> "Transformation":
        """The way back, as a transformation of its own."""
        turned = Transformation.__new__(Transformation)
        _core.Transformation.__init__(turned, self)
        turned._settle(self.target, self.source, (*self._key[:3], not self._key[3]))
        return turned

    @property
    def ufunc(self) -> np.ufunc:
        """The numpy ufunc of two coordinates: two inputs, two results."""
        return self._ufuncs(2, False)

    @property
    def ufunc3(self) -> np.ufunc:
        """The numpy ufunc of three coordinates."""
        return self._ufuncs(3, False)

    @with_keywords
    def _call(self, x: Array, y: Array, z: Optional[Array] = None, **keywords: Any) -> Any:
        """Transforms points.

        Parameters
        ----------
        x, y : array_like
            Longitudes or eastings, latitudes or northings; they broadcast.
        z : array_like, optional
            Heights in metres, or Z.
        %KEYWORDS%

        Returns
        -------
        tuple
            x and y, with z where it was given, and the words with ``errors="words"``: numbers
            for numbers, float32 for float32, series for series.
        """
        axes = 2 if z is None else 3
        inputs = (x, y) if z is None else (x, y, z)
        return run(self, lambda words: self._ufuncs(axes, words), inputs, **keywords)

    def describe(self) -> str:
        """The steps in words, a line each, with the operation taken and its accuracy."""
        text = self._describe()
        return f"the way back of:\n{text}" if self._key[3] else text

    @staticmethod
    def candidates(
        source: Any,
        target: Any,
        *,
        grid_folders: Sequence[str] = (),
        epoch: Optional[float] = None,
        area: Optional[Bounds] = None,
    ) -> "list[Candidate]":
        """All operations that lead from one system's datum to the other's, best first."""
        found = _core.Transformation._candidates(
            System(source), System(target), [str(folder) for folder in grid_folders], epoch, area
        )
        return [Candidate(*one) for one in found]

    def __reduce__(self):
        return _again, (Transformation, self._key)

    def __repr__(self) -> str:
        return f"Transformation({self.source!r}, {self.target!r})"


class Factors(NamedTuple):
    """How a projection distorts at points.

    Attributes
    ----------
    meridional, parallel : scale along the meridian and along the parallel
    areal : scale of areas
    convergence : bearing of grid north from true north, degrees, clockwise positive
    angular : largest angular distortion, degrees
    """

    meridional: Any
    parallel: Any
    areal: Any
    convergence: Any
    angular: Any


class Projection(_core.Projection):
    """A map projection of an ellipsoid: degrees to metres when it is called.

    Parameters
    ----------
    method : str
        In the field's words or the registry's: ``"transverse mercator"``, ``"EPSG:9802"``.
    parameters : mapping, optional
        By the field's words (``{"latitude of origin": 46.5}``), the registry's names or the
        short forms; degrees and metres.
    ellipsoid : str or Ellipsoid
    **short
        The same by short forms: ``lat0``, ``lon0``, ``lat1``, ``lat2``, ``k0``, ``x0``, ``y0``.

    Raises
    ------
    tidewater.Error
        For an unknown method, a parameter that it does not take, or a value it cannot serve.
    """

    def __init__(
        self,
        method: str,
        parameters: Optional[Mapping[str, float]] = None,
        ellipsoid: Union[str, Ellipsoid] = "WGS 84",
        **short: float,
    ) -> None:
        if not isinstance(ellipsoid, Ellipsoid):
            ellipsoid = Ellipsoid(ellipsoid)
        given = tuple((str(k), float(v)) for k, v in {**(parameters or {}), **short}.items())
        super().__init__(method, list(given), ellipsoid)
        self._settle((_made, (method, given, ellipsoid)), False)

    def _settle(self, origin: tuple, back: bool) -> None:
        self._origin = origin
        self._back = back
        self._ufuncs = Ufuncs(self._ufunc)
        self._factors = Ufuncs(self._factors_ufunc)

    @classmethod
    def _around(cls, native: _core.Projection, origin: tuple, back: bool = False) -> "Projection":
        made = cls.__new__(cls)
        _core.Projection.__init__(made, native, back)
        made._settle(origin, back)
        return made

    @classmethod
    def _from_key(cls, key: tuple) -> "Projection":
        (function, arguments), back = key
        made = function(*arguments)
        return made.inverse if back else made

    @functools.cached_property
    def inverse(self) -> "Projection":
        """Metres to degrees."""
        turned = Projection.__new__(Projection)
        _core.Projection.__init__(turned, self, True)
        turned._settle(self._origin, not self._back)
        return turned

    @property
    def ufunc(self) -> np.ufunc:
        """The numpy ufunc of the call."""
        return self._ufuncs(2, False)

    @with_keywords
    def _call(self, x: Array, y: Array, **keywords: Any) -> Any:
        """Longitude, latitude in degrees to easting, northing in metres.

        Parameters
        ----------
        x, y : array_like
        %KEYWORDS%
        """
        return run(self, lambda words: self._ufuncs(2, words), (x, y), **keywords)

    @with_keywords
    def factors(self, lon: Array, lat: Array, **keywords: Any) -> Any:
        """Distortion at points, by differences of the forward formula to 1e-9 of a scale.

        Parameters
        ----------
        lon, lat : array_like
            Degrees.
        %KEYWORDS%

        Returns
        -------
        Factors
            Followed by the words with ``errors="words"``, as a plain tuple.
        """
        result = run(self.factors, self._factors, (lon, lat), **keywords)
        return Factors(*result) if len(result) == 5 else result

    def __reduce__(self):
        return _again, (Projection, (self._origin, self._back))

    def __repr__(self) -> str:
        return f"<{'inverse ' if self._back else ''}{self.method}>"


def _made(method: str, given: tuple, ellipsoid: Ellipsoid) -> Projection:
    return Projection(method, dict(given), ellipsoid)
