"""Angles, positions and grid references as people write them."""

from __future__ import annotations

from typing import Any, Optional, Tuple

import numpy as np

from . import _core

_AXES = {None: 0, "longitude": 1, "latitude": 2}
_ORDERS = {None: 0, "longitude first": 1, "latitude first": 2}
_FORMS = {"degrees": 0, "minutes": 1, "seconds": 2, "packed": 3}
_MARKS = {"none": 0, "symbols": 1, "plain": 2, "colons": 3, "blanks": 4}


def _choice(name: str, choices: dict, value: Any) -> int:
    if value not in choices:
        raise ValueError(f"{name} is one of {', '.join(map(repr, choices))}, not {value!r}.")
    return choices[value]


def _read(text: Any, errors: str, read: Any, figures: int) -> Any:
    if errors not in ("nan", "raise", "words"):
        raise ValueError(f'errors is "nan", "raise" or "words", not {errors!r}.')
    single = isinstance(text, str)
    texts = np.asarray(text, dtype=object)
    # What is missing in a table is no text, and is not read as one.
    values, reasons = read(["" if v is None or v != v else str(v) for v in texts.ravel()])
    if errors == "raise":
        for at, reason in enumerate(reasons):
            if reason:
                raise _core.Error(reason if single else f"Text {at}: {reason}")
    columns = [values[k].reshape(texts.shape) for k in range(figures)]
    if single:
        columns = [float(column) for column in columns]
    if errors == "words":
        columns.append(reasons[0] if single else np.array(reasons, object).reshape(texts.shape))
    return columns[0] if len(columns) == 1 else tuple(columns)


def parse(text: Any, axis: Optional[str] = None, *, decimal_comma: bool = False,
          errors: str = "nan") -> Any:
    """Reads angles: ``48°51'24"N``, ``N 48 51.4``, ``-48.5``, ``485124N`` and so on.

    Parameters
    ----------
    text : str or array_like of str
    axis : {None, "longitude", "latitude"}
        What is expected; a letter of the other axis is refused.
    decimal_comma : bool
        The comma is a decimal mark.
    errors : {"nan", "raise", "words"}
        What becomes of texts that are no angles: NaN, a `tidewater.Error`, or one
        result more, which holds the reason in a sentence for each text and is empty where there
        is none.

    Returns
    -------
    float or ndarray of float64
        Degrees, east and north positive.
    """
    number = _choice("axis", _AXES, axis)
    return _read(text, errors, lambda texts: _core.parse_angles(texts, number, decimal_comma), 1)


def parse_position(text: Any, order: Optional[str] = None, *, decimal_comma: bool = False,
                   errors: str = "nan") -> Any:
    """Reads positions: ``48°51'24"N 2°21'03"E``, ``2.35 48.85``, ``+48.8577+002.2950/``.

    Parameters
    ----------
    text : str or array_like of str
    order : {None, "longitude first", "latitude first"}
        Which angle stands first where no letter tells; without it such a text is refused.
    decimal_comma, errors
        As in `parse`.

    Returns
    -------
    tuple
        Longitude and latitude in degrees, and height in metres, NaN without one.
    """
    number = _choice("order", _ORDERS, order)
    return _read(text, errors,
                 lambda texts: _core.parse_positions(texts, number, decimal_comma), 3)


def parse_mgrs(text: Any, *, errors: str = "nan") -> Any:
    """Reads references of the military grid: the centres of their squares.

    Returns
    -------
    tuple
        Longitude and latitude in degrees on WGS 84.
    """
    return _read(text, errors, _core.parse_mgrs, 2)


def _written(texts: list, shape: Tuple[int, ...]) -> Any:
    return texts[0] if shape == () else np.array(texts, object).reshape(shape)


def format(degrees: Any, form: str = "degrees", *, marks: str = "none", precision: int = 8,
           axis: Optional[str] = None) -> Any:
    """Writes angles; 60 minutes or seconds never appear.

    Parameters
    ----------
    degrees : float or array_like
    form : {"degrees", "minutes", "seconds", "packed"}
    marks : {"none", "symbols", "plain", "colons", "blanks"}
        What stands between the parts.
    precision : int
        Decimals of the last part, 0 to 15; in minutes and seconds at most 9.
    axis : {None, "longitude", "latitude"}
        Puts a letter behind instead of a sign in front.

    Returns
    -------
    str or ndarray of str
    """
    values = np.asarray(degrees, float)
    texts = _core.format_angles(
        values.ravel().tolist(), _choice("form", _FORMS, form), _choice("marks", _MARKS, marks),
        int(precision), _choice("axis", _AXES, axis))
    return _written(texts, values.shape)


def format_mgrs(lon: Any, lat: Any, digits: int = 5, *, blanks: bool = False) -> Any:
    """The military grid references of the squares that hold points of WGS 84.

    Parameters
    ----------
    lon, lat : array_like
        Degrees; they broadcast.
    digits : int
        0 to 11 of easting and northing each; 5 is a metre.
    blanks : bool
        ``"31U DQ 48251 11932"`` instead of ``"31UDQ4825111932"``.

    Returns
    -------
    str or ndarray of str
        Empty for a point that has none.
    """
    lon, lat = np.broadcast_arrays(np.asarray(lon, float), np.asarray(lat, float))
    texts = _core.format_mgrs(lon.ravel().tolist(), lat.ravel().tolist(), int(digits), blanks)
    return _written(texts, lon.shape)
