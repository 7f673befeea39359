"""Grids of datum shifts and of geoid undulations, and magnetic models."""

from __future__ import annotations

import functools
from typing import Any, NamedTuple, Optional, Sequence

from . import _core
from ._call import Array, Ufuncs, run, with_keywords
from ._systems import _again


class ShiftGrid(_core.ShiftGrid):
    """A grid of datum shifts (NTv2, NADCON or GeoTIFF); call it with positions.

    Parameters
    ----------
    name : str
        The file.
    folders : sequence of str
        Where it is looked for; without any the name is taken as it is.
    """

    def __init__(self, name: str, folders: Sequence[str] = ()) -> None:
        folders = tuple(str(folder) for folder in folders)
        super().__init__(str(name), list(folders))
        self._settle((str(name), folders, False))

    def _settle(self, key: tuple) -> None:
        self._key = key
        self._ufuncs = Ufuncs(self._ufunc)

    @classmethod
    def _from_key(cls, key: tuple) -> "ShiftGrid":
        made = cls(*key[:-1])
        return made.inverse if key[-1] else made

    @functools.cached_property
    def inverse(self) -> "ShiftGrid":
        """From the target datum to the source datum."""
        turned = type(self).__new__(type(self))
        _core.ShiftGrid.__init__(turned, self)
        turned._settle((*self._key[:-1], not self._key[-1]))
        return turned

    @with_keywords
    def _call(self, lon: Array, lat: Array, **keywords: Any) -> Any:
        """Shifts positions from the source datum to the target datum.

        Parameters
        ----------
        lon, lat : array_like
            Degrees.
        %KEYWORDS%
        """
        return run(self, lambda words: self._ufuncs(2, words), (lon, lat), **keywords)

    def __reduce__(self):
        return _again, (ShiftGrid, self._key)

    def __repr__(self) -> str:
        return f"<{self.describe()}>"


class GeoidGrid(_core.GeoidGrid):
    """A grid of geoid undulations; call it with heights above the geoid.

    Parameters
    ----------
    name : str
        The file: .gtx, .geo or GeoTIFF.
    folders : sequence of str
        Where it is looked for; without any the name is taken as it is.
    biquadratic : bool
        Interpolation of the second order instead of bilinear.
    """

    def __init__(self, name: str, folders: Sequence[str] = (), biquadratic: bool = False) -> None:
        folders = tuple(str(folder) for folder in folders)
        super().__init__(str(name), list(folders), biquadratic)
        self._settle((str(name), folders, biquadratic, False))

    def _settle(self, key: tuple) -> None:
        self._key = key
        self._ufuncs = Ufuncs(self._ufunc)
        self._undulations = Ufuncs(self._undulation_ufunc)

    @classmethod
    def _from_key(cls, key: tuple) -> "GeoidGrid":
        made = cls(*key[:-1])
        return made.inverse if key[-1] else made

    @functools.cached_property
    def inverse(self) -> "GeoidGrid":
        """Heights above the ellipsoid to heights above the geoid."""
        turned = GeoidGrid.__new__(GeoidGrid)
        _core.GeoidGrid.__init__(turned, self)
        turned._settle((*self._key[:-1], not self._key[-1]))
        return turned

    @with_keywords
    def __call__(self, lon: Array, lat: Array, height: Array, **keywords: Any) -> Any:
        """Heights above the geoid to heights above the ellipsoid.

        Parameters
        ----------
        lon, lat : array_like
            Degrees.
        height : array_like
            Metres.
        %KEYWORDS%

        Returns
        -------
        tuple
            Longitude, latitude, height.
        """
        return run(self, lambda words: self._ufuncs(3, words), (lon, lat, height), **keywords)

    @with_keywords
    def undulation(self, lon: Array, lat: Array, **keywords: Any) -> Any:
        """Height above the ellipsoid less height above the geoid, metres.

        Parameters
        ----------
        lon, lat : array_like
            Degrees.
        %KEYWORDS%
        """
        return run(self.undulation, self._undulations, (lon, lat), **keywords)

    def __reduce__(self):
        return _again, (GeoidGrid, self._key)

    def __repr__(self) -> str:
        return f"<{self.describe()}>"


class MagneticField(NamedTuple):
    """The field at points, or its change in a year: nanotesla and degrees.

    Declination is east positive, inclination downwards positive.
    """

    north: Any
    east: Any
    down: Any
    horizontal: Any
    total: Any
    declination: Any
    inclination: Any


class MagneticModel(_core.MagneticModel):
    """A spherical harmonic model of the Earth's magnetic field at a date.

    Parameters
    ----------
    name : str
        ``"WMM2025"``, ``"IGRF-13"``; ``"IGRF"`` for the generation in force; empty for the newest.
    year : float
        Decimal year.

    Raises
    ------
    tidewater.Error
        If the store has no such model, or the model no field at that date.
    """

    def __init__(self, name: str = "", *, year: float) -> None:
        super().__init__(name, float(year))
        self._key = (name, float(year))
        self._ufuncs = Ufuncs(self._ufunc)

    @classmethod
    def _from_key(cls, key: tuple) -> "MagneticModel":
        return cls(key[0], year=key[1])

    @with_keywords
    def field(self, lon: Array, lat: Array, height: Array = 0.0, **keywords: Any) -> Any:
        """The field at points.

        Parameters
        ----------
        lon, lat : array_like
            Degrees on WGS 84.
        height : array_like
            Metres above the ellipsoid.
        %KEYWORDS%

        Returns
        -------
        MagneticField
            Followed by the words with ``errors="words"``, as a plain tuple.
        """
        return self._values(self.field, False, lon, lat, height, keywords)

    @with_keywords
    def yearly(self, lon: Array, lat: Array, height: Array = 0.0, **keywords: Any) -> Any:
        """How much the field changes in a year; otherwise as `field`.

        Parameters
        ----------
        lon, lat : array_like
            Degrees on WGS 84.
        height : array_like
            Metres above the ellipsoid.
        %KEYWORDS%
        """
        return self._values(self.yearly, True, lon, lat, height, keywords)

    def _values(self, again: Any, yearly: bool, lon: Array, lat: Array, height: Array,
                keywords: dict) -> Any:
        result = run(again, lambda words: self._ufuncs(yearly, words), (lon, lat, height),
                     **keywords)
        return MagneticField(*result) if len(result) == 7 else result

    def declination(self, lon: Array, lat: Array, height: Array = 0.0, **keywords: Any) -> Any:
        """The declination alone, degrees east of true north."""
        return self.field(lon, lat, height, **keywords)[5]

    def __reduce__(self):
        return _again, (MagneticModel, self._key)

    def __repr__(self) -> str:
        return f"MagneticModel({self.name!r}, year={self.year!r})"
