"""The two libraries by ctypes, with the argument lists of their headers.

contract("TWlam_c", e=0.08, lat0=...) calls a function by the names of its arguments: what is given
goes in, what is not given and is a pointer comes out.  Constants are handed on by name:

    k = contract("TWlam_c", e=e, lon0=0, lat0=lat0, lat1=lat1, lat2=lat2)
    xy = points("TWlam_f", lon_lat, **k, lon0=0)
"""

import ctypes
import os
import re
from pathlib import Path

import numpy as np

SOURCE = Path(__file__).resolve().parent.parent
BUILD = Path(os.environ.get("TIDEWATER_BUILD", SOURCE / "build" / "release"))
SUCCESS = 0x0FCF8009
ROOM = 512  # doubles behind each pointer that a caller leaves out

os.environ.setdefault("TIDEWATER_STORE", str(BUILD / "tidewater.store"))


def _load(pattern, mode=ctypes.DEFAULT_MODE):
    found = sorted(BUILD.glob(pattern))
    if not found:
        raise SystemExit(f"{pattern} is not in {BUILD}; build first, or set TIDEWATER_BUILD.")
    return ctypes.CDLL(str(found[0]), mode)


_load("store/libtabdll.so*", ctypes.RTLD_GLOBAL)
_core = _load("src/libtidewater.so*", ctypes.RTLD_GLOBAL)
_systems = _load("systems/libtidewater_systems.so*")


class Triple(ctypes.Structure):
    _fields_ = [("x", ctypes.c_double), ("y", ctypes.c_double), ("z", ctypes.c_double)]


TRANSFORM = ctypes.CFUNCTYPE(None, ctypes.c_void_p, ctypes.c_int32, ctypes.c_void_p,
                             ctypes.c_void_p, ctypes.POINTER(ctypes.c_uint32))
_SCALARS = {"double": ctypes.c_double, "int32_t": ctypes.c_int32, "int16_t": ctypes.c_int16,
            "uint32_t": ctypes.c_uint32, "uint16_t": ctypes.c_uint16, "float": ctypes.c_float,
            "CoordinateTriple": Triple, "TWcontext": ctypes.c_size_t}
_DTYPES = {"double": np.float64, "int32_t": np.int32, "int16_t": np.int16, "uint32_t": np.uint32,
           "uint16_t": np.uint16, "float": np.float32, "CoordinateTriple": np.float64,
           "TWstatus": np.uint32, "NadconControl": np.float64, "GeoidControl": np.float64}


def _prototypes():
    found = {}
    for header in sorted((SOURCE / "include" / "tidewater").rglob("*.h")):
        text = re.sub(r"/\*.*?\*/|//[^\n]*", "", header.read_text(), flags=re.S)
        for result, name, arguments in re.findall(r"TW_API\s+(\w+)\s+(\w+)\(([^()]*)\);", text):
            listed = []
            for argument in arguments.split(","):
                words = re.match(r"\s*(const\s+)?(\w+)\s*(\**)\s*(\w+)", argument)
                if words:
                    listed.append((words[4], words[2], len(words[3]), bool(words[1])))
            found[name] = (result, listed)
    return found


PROTOTYPES = _prototypes()


def contract(name, **given):
    """Calls a function; its inputs and outputs by name, and its word as "status"."""
    result, arguments = PROTOTYPES[name]
    function = getattr(_core, name)
    function.restype = _SCALARS.get(result)
    values, kept = [], dict(given)
    status = np.zeros(1, np.uint32)
    for argument, kind, stars, _ in arguments:
        if kind == "TWstatus":
            values.append(status.ctypes.data_as(ctypes.c_void_p))
        elif kind in ("TWtransform", "TWtransform_ptr"):
            values.append(ctypes.cast(given[argument], ctypes.c_void_p))
        elif kind == "char":
            values.append(ctypes.c_char_p(given[argument]))
        elif stars == 0 and kind != "void":
            value = given.get(argument, 0)
            if kind == "CoordinateTriple":
                values.append(Triple(*value))
            else:
                value = value[0] if isinstance(value, np.ndarray) else value
                values.append(_SCALARS[kind](value))
        elif kind == "void":
            values.append(ctypes.c_void_p(0))
        else:
            array = given.get(argument)
            if not isinstance(array, np.ndarray):
                room = np.zeros(ROOM, _DTYPES[kind])
                if array is not None:
                    room[:np.size(array)] = array
                array = room
            array = np.ascontiguousarray(array, _DTYPES[kind])
            kept[argument] = array
            values.append(array.ctypes.data_as(ctypes.c_void_p))
    function(*values)
    kept.update(status=int(status[0]))
    return kept


def points(name, array, in_place=False, **given):
    """Calls an array function on rows of two or three; a point that fails is not-a-number."""
    given = {key: value for key, value in given.items() if key != "status"}
    array = np.asarray(array, np.float64)
    rows = np.zeros((len(array), 3))
    rows[:, :array.shape[1]] = array
    out = rows if in_place else np.full_like(rows, np.nan)
    given.update({"in": rows, "out": out, "count": len(rows)})
    answer = contract(name, **given)["out"]
    # Some functions stop at a point that fails: those behind it are asked one by one.
    failed = np.flatnonzero(~np.isfinite(answer[:, 0])) if not in_place else []
    if 0 < len(failed) < len(rows):
        for i in failed:
            one = {**given, "in": rows[i:i + 1].copy(), "out": np.full((1, 3), np.nan), "count": 1}
            answer[i] = contract(name, **one)["out"]
    return answer


# --- the systems layer ------------------------------------------------------------------------


class Points(ctypes.Structure):
    _fields_ = [("x", ctypes.c_void_p), ("y", ctypes.c_void_p), ("z", ctypes.c_void_p),
                ("stride", ctypes.c_ssize_t)]


class Factors(ctypes.Structure):
    _fields_ = [(name, ctypes.c_double)
                for name in ("meridional", "parallel", "areal", "convergence", "angular")]


def _function(name, result, *arguments):
    function = getattr(_systems, name)
    function.restype = result
    function.argtypes = arguments
    return function


_V, _I, _S, _D = ctypes.c_void_p, ctypes.c_int32, ctypes.c_size_t, ctypes.c_double
_T, _P = ctypes.c_char_p, ctypes.POINTER(Points)
_last_error = _function("tw_last_error", _T)
_system = _function("tw_system_create", _V, _T)
_transformation = _function("tw_transformation_create", _V, _V, _V, _V)
_transform = _function("tw_transform", _S, _V, _I, _S, _P, _P, _V, ctypes.c_uint32)
_system_method = _function("tw_system_method", _S, _V, _T, _S)
_projection_of = _function("tw_projection_of", _V, _V)
_projection = _function("tw_projection_create", _V, _T, _S, _V, _V, _D, _D)
_method_count = _function("tw_projection_method_count", _S)
_method_name = _function("tw_projection_method", _S, _S, _T, _S)
_project = _function("tw_project", _S, _V, _I, _S, _P, _P, _V, ctypes.c_uint32)
_factors = _function("tw_project_factors", _S, _V, _S, _P, _V, _V)
_lines = _function("tw_lines_create", _V, _I, _D, _D)
_direct = _function("tw_lines_direct", _S, _V, _S, *[_V] * 7)
_inverse = _function("tw_lines_inverse", _S, _V, _S, *[_V] * 7)
_polygon = _function("tw_lines_polygon", None, _V, _S, *[_V] * 4)
_model = _function("tw_magnetic_model_create", _V, _T, _D)
_field = _function("tw_magnetic_field", _S, _V, _S, _P, _V, _V)
_parse_angle = _function("tw_parse_angle", _I, _T, _I, _I, _V)
_parse_position = _function("tw_parse_position", _I, _T, _I, _I, _V)
_format_mgrs = _function("tw_format_mgrs", _S, _D, _D, _I, _T, _S)
_parse_mgrs = _function("tw_parse_mgrs", _I, _T, _V)


def _made(handle, what):
    if not handle:
        raise ValueError(f"{what}: {_last_error().decode()}")
    return handle


def _columns(array):
    array = np.asarray(array, np.float64)
    columns = [np.ascontiguousarray(array[:, i]) for i in range(array.shape[1])]
    while len(columns) < 3:
        columns.append(np.zeros(len(array)))
    return columns


def _of(columns):
    return Points(*(c.ctypes.data for c in columns), 1)


class Projection:
    """The projection of a definition ("albers lat1=44 ... ellps=GRS80"), degrees and metres.

    Or of a method and its parameters by their names, on an ellipsoid of that axis and flattening.
    """

    def __init__(self, definition, parameters=None, a=0.0, inverse_flattening=0.0):
        if parameters is None:
            system = _made(_system(definition.encode()), definition)
            self.handle = _made(_projection_of(system), definition)
            text = ctypes.create_string_buffer(200)
            _system_method(system, text, 200)
            self.method = text.value.decode()
        else:
            names = (ctypes.c_char_p * len(parameters))(*(name.encode() for name in parameters))
            values = (_D * len(parameters))(*parameters.values())
            self.handle = _made(_projection(definition.encode(), len(parameters), names, values, a,
                                            inverse_flattening), definition)
            self.method = definition

    def _run(self, inverse, array):
        given, out = _columns(array), _columns(np.zeros((len(array), 3)))
        _project(self.handle, inverse, len(array), _of(given), _of(out), None, 1)
        return np.column_stack(out[:2])

    def forward(self, array):
        return self._run(0, array)

    def inverse(self, array):
        return self._run(1, array)

    def factors(self, array):
        given, out = _columns(array), (Factors * len(array))()
        _factors(self.handle, len(array), _of(given), out, None)
        return np.array([[getattr(f, name) for name, _ in Factors._fields_] for f in out])


def methods():
    """The names of the methods of projection."""
    text = ctypes.create_string_buffer(200)
    names = []
    for i in range(_method_count()):
        _method_name(i, text, 200)
        names.append(text.value.decode())
    return names


class Options(ctypes.Structure):
    _fields_ = [("operation", ctypes.c_char_p), ("grid_folders", ctypes.c_char_p),
                ("epoch", ctypes.c_double), ("area", ctypes.c_void_p), ("radians", ctypes.c_int32),
                ("own_axes", ctypes.c_int32)]


class Transformation:
    def __init__(self, source, target, operation=None):
        options = Options(operation.encode() if operation else None)
        self.handle = _made(_transformation(_made(_system(source.encode()), source),
                                            _made(_system(target.encode()), target),
                                            ctypes.addressof(options)), f"{source} to {target}")

    def __call__(self, array, inverse=False):
        given, out = _columns(array), _columns(np.zeros((len(array), 3)))
        _transform(self.handle, inverse, len(array), _of(given), _of(out), None, 1)
        return np.column_stack(out)


class Lines:
    """Geodesics or rhumb lines; degrees, metres."""

    def __init__(self, rhumb, a, f):
        self.handle = _made(_lines(rhumb, a, f), "lines")

    def _run(self, function, columns):
        columns = [np.ascontiguousarray(c, np.float64) for c in columns]
        out = [np.zeros(len(columns[0])) for _ in range(3)]
        function(self.handle, len(columns[0]), *(c.ctypes.data for c in columns + out))
        return out

    def direct(self, lon, lat, azimuth, length):
        return self._run(_direct, [lon, lat, azimuth, length])

    def inverse(self, lon1, lat1, lon2, lat2):
        return self._run(_inverse, [lon1, lat1, lon2, lat2])

    def polygon(self, lon, lat):
        lon, lat = (np.ascontiguousarray(c, np.float64) for c in (lon, lat))
        out = np.zeros(2)
        _polygon(self.handle, len(lon), lon.ctypes.data, lat.ctypes.data, out.ctypes.data,
                 out.ctypes.data + 8)
        return out


def magnetic_field(model, year, array):
    """North, east, down in nT."""
    handle = _made(_model(model.encode(), year), model)
    given, out = _columns(array), np.zeros((len(array), 14))
    _field(handle, len(array), _of(given), out.ctypes.data, None)
    return out[:, :3]


def parse_angle(text):
    value = np.full(1, np.nan)
    _parse_angle(text.encode(), 0, 0, value.ctypes.data)
    return value[0]


def parse_position(text):
    """Longitude and latitude of a text that gives the latitude first."""
    position = np.full(3, np.nan)
    _parse_position(text.encode(), 2, 0, position.ctypes.data)
    return position[:2]


def mgrs_of(lon, lat, digits):
    text = ctypes.create_string_buffer(40)
    _format_mgrs(lon, lat, digits, text, 40)
    return text.value.decode()


def position_of_mgrs(text):
    position = np.full(2, np.nan)
    _parse_mgrs(text.encode(), position.ctypes.data)
    return position
