"""How all calls on arrays are run: errors, threads and arrays that live elsewhere."""

from __future__ import annotations

import functools
from typing import Any, Callable, Optional, Sequence

import numpy as np

from . import _core

Array = Any
"""A number, or anything that numpy takes for an array of numbers."""


class PointError(_core.Error):
    """A point had no result and ``errors="raise"`` was asked for.

    Attributes
    ----------
    index : tuple of int
        Where the first such point stands.
    word : int
        Its status word.
    """

    def __init__(self, index: tuple, word: int) -> None:
        where = f"Point {list(index)}: " if index else ""
        super().__init__(where + _core.status_text(word))
        self.index = index
        self.word = word


def run(
    again: Callable,
    ufunc: Callable[[bool], np.ufunc],
    inputs: Sequence[Array],
    *,
    errors: str = "nan",
    threads: int = 1,
    out: Any = None,
    where: Any = True,
) -> Any:
    """Runs a ufunc under the keywords that all calls share.

    Parameters
    ----------
    again : callable
        The public call, for arrays in pieces; it must pickle.
    ufunc : callable
        Gives the ufunc, without or with words.
    inputs : sequence
        The operands.
    errors, threads, out, where
        As the public calls say.
    """
    if errors not in ("nan", "raise", "words"):
        raise ValueError(f'errors is "nan", "raise" or "words", not {errors!r}.')
    threads = int(threads)
    if threads < 0:
        raise ValueError("threads is a count, or 0 for all cores.")
    if any(hasattr(value, "__dask_graph__") and hasattr(value, "chunks") for value in inputs):
        return _run_dask(again, ufunc, inputs, errors, threads)

    words = errors != "nan"
    function = ufunc(words)
    keywords: dict = {}
    if out is not None:
        out = out if isinstance(out, tuple) else (out,)
        if len(out) != function.nout - words and len(out) != function.nout:
            raise ValueError(f"out takes {function.nout - words} arrays here.")
    if where is not True:
        keywords["where"] = where
    # Points that are not asked for have no word of their own.
    if words and (where is not True or out is not None):
        given = () if out is None else out
        if len(given) < function.nout:
            shape = np.broadcast_shapes(
                np.shape(where), *(np.shape(value) for value in (*inputs, *given))
            )
            blank = given or (None,) * (function.nout - 1)
            out = (*blank, np.full(shape, _core.SUCCESS, np.uint32))
    if out is not None:
        keywords["out"] = out

    before = _core.set_threads(threads)
    try:
        result = function(*inputs, **keywords)
    finally:
        _core.set_threads(before)
    if errors == "raise":
        found = np.asarray(result[-1])
        failed = found != _core.SUCCESS
        if failed.any():
            index = np.unravel_index(int(np.argmax(failed)), found.shape)
            raise PointError(tuple(int(i) for i in index), int(found[index]))
        result = result[:-1]
        return result if len(result) > 1 else result[0]
    return result


# Dask names what is on its way by the function, in letters that a scheduler takes apart.
def _chunk(again: Callable, *inputs: Array, **keywords: Any) -> Any:
    return again(*inputs, **keywords)


def _run_dask(again, ufunc, inputs, errors, threads):
    import dask.array

    function = ufunc(errors == "words")
    single = function.types[0].startswith("f") and np.result_type(*inputs) == np.float32
    results = ["float32" if single else "float64"] * function.nout
    if errors == "words":
        results[-1] = "uint32"
    signature = ",".join(["()"] * len(inputs)) + "->" + ",".join(["()"] * function.nout)
    piece = functools.partial(_chunk, again, errors=errors, threads=threads)
    if function.nout == 1:
        return dask.array.apply_gufunc(piece, signature, *inputs, output_dtypes=results[0])
    return dask.array.apply_gufunc(piece, signature, *inputs, output_dtypes=results)


class Ufuncs:
    """The ufuncs of an object, made when they are first asked for."""

    def __init__(self, make: Callable[..., np.ufunc]) -> None:
        self._make = make
        self._made: dict = {}

    def __call__(self, *key: Any) -> np.ufunc:
        try:
            return self._made[key]
        except KeyError:
            return self._made.setdefault(key, self._make(*key))


KEYWORDS = """errors : {"nan", "raise", "words"}
        What becomes of points without a result: NaN in silence, a
        `PointError` for the first, or an array of status words as one result more
        (`tidewater.SUCCESS`, or what `tidewater.status_text` says of it).
    threads : int
        How many at most; 0 for all cores.  The interpreter's lock is released.
    out : tuple of arrays, optional
        Where results go, as in every ufunc; an input's own array is fine.
    where : array of bool, optional
        Which points are computed; the others stay what they are in `out`."""


def with_keywords(function: Callable) -> Callable:
    """Puts the shared keywords into a docstring."""
    if function.__doc__:
        function.__doc__ = function.__doc__.replace("%KEYWORDS%", KEYWORDS)
    return function
