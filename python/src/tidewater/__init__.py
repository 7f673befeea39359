"""Tidewater: map projections, datum shifts, geodesics and magnetics on numpy arrays.

Longitude or easting first, degrees, metres.  Every call takes numbers or arrays, as a numpy ufunc
does; objects are made once and may be used from any number of threads.

>>> import tidewater
>>> t = tidewater.Transformation("EPSG:4326", "EPSG:2154")
>>> x, y = t([2.35, 5.37], [48.85, 43.30], threads=0)
"""

from typing import Any

from ._core import SUCCESS, Error, status_text
from ._core import version as __version__
from ._call import PointError
from ._fields import GeoidGrid, MagneticField, MagneticModel, ShiftGrid
from ._lines import Course, End, Geodesic, Polygon, Rhumb
from ._systems import (
    Candidate,
    Ellipsoid,
    Factors,
    FoundSystem,
    Projection,
    System,
    Transformation,
)
from ._text import format, format_mgrs, parse, parse_mgrs, parse_position
from ._transformer import TransformDirection, Transformer

__all__ = [
    "Candidate", "Course", "Ellipsoid", "End", "Error", "Factors", "FoundSystem", "Geodesic",
    "GeoidGrid", "MagneticField", "MagneticModel", "PointError", "Polygon", "Projection", "Rhumb",
    "SUCCESS", "ShiftGrid", "System", "TransformDirection", "Transformation", "Transformer", "format",
    "format_mgrs", "parse", "parse_mgrs", "parse_position", "status_text", "to_system",
]


def to_system(frame: Any, target: Any, **keywords: Any) -> Any:
    """A GeoDataFrame or GeoSeries in another system; see `tidewater.frames.to_system`."""
    from .frames import to_system as implementation

    return implementation(frame, target, **keywords)
