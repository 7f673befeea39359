"""Points, errors and rows of the table."""

from dataclasses import dataclass, field

import mpmath as mp
import numpy as np

import formulas

A, INVERSE_F = 6378137.0, 298.257222101  # GRS 1980
E2 = (2 - 1 / INVERSE_F) / INVERSE_F
E = float(np.sqrt(E2))
FLAT = 1 / INVERSE_F
DEGREE = np.pi / 180
NONE = "–"
MP = "formula, 50 digits"
e = mp.mpf(E)  # as the library is given it


def scatter(low, high, count):
    """Points of a box, evenly strewn: the additive sequence of the plastic number."""
    g = 1.32471795724474602596
    i = np.arange(1, count + 1)
    unit = np.column_stack([(0.5 + i / g) % 1, (0.5 + i / g ** 2) % 1])
    return np.asarray(low) + (np.asarray(high) - np.asarray(low)) * unit


def exactly(forward, points):
    """A reference's plane points, one row of long numbers each."""
    return [forward(mp.mpf(float(p[0])), mp.mpf(float(p[1]))) for p in points]


def rounded(exact):
    return np.array([[float(v) for v in row] for row in exact])


def apart(exact, got):
    """Distances between long numbers and doubles."""
    result = []
    for row, point in zip(exact, got):
        if not np.all(np.isfinite(point[:len(row)])):
            result.append(np.nan)
        else:
            result.append(float(mp.sqrt(sum((v - mp.mpf(float(p))) ** 2
                                            for v, p in zip(row, point)))))
    return np.array(result)


def on_the_ground(a, truth, got):
    """Metres between two arrays of longitude and latitude in radians."""
    turn = np.remainder(truth[:, 0] - got[:, 0] + np.pi, 2 * np.pi) - np.pi
    return a * np.hypot(turn * np.cos(truth[:, 1]), truth[:, 1] - got[:, 1])


@dataclass
class Error:
    """The worst, and what 95 of 100 stay below."""
    worst: float
    usual: float
    unit: str = "m"
    refused: int = 0

    @classmethod
    def of(cls, values, unit="m"):
        good = values[np.isfinite(values)]
        if not len(good):
            return None
        return cls(float(good.max()), float(np.quantile(good, 0.95)), unit,
                   int(len(values) - len(good)))

    def __str__(self):
        text = f"{shown(self.worst, self.unit)} ({shown(self.usual, self.unit)})"
        return text + (f", {self.refused} refused" if self.refused else "")


def shown(value, unit):
    """A figure in the unit that suits it."""
    if unit == "m":
        for size, name in ((1000, "km"), (1, "m"), (1e-3, "mm"), (1e-6, "µm"), (1e-9, "nm")):
            if value >= size:
                return f"{value / size:.{0 if value >= 10 * size else 1}f} {name}"
        return "< 1 nm"
    if value == 0:
        return f"0 {unit}".strip()
    return f"{value:.1e} {unit}".strip()


@dataclass
class Row:
    family: str
    calls: str
    domain: str
    against: str
    count: int
    forward: object = None
    inverse: object = None
    scale: object = None
    note: str = ""
    extra: dict = field(default_factory=dict)

    def line(self):
        cells = [self.family, self.calls, self.domain, self.forward, self.inverse, self.scale,
                 self.against, self.count, self.note]
        return "| " + " | ".join(NONE if c is None or c == "" else str(c) for c in cells) + " |"


def distortions(e, reference, points):
    return [formulas.distortion(e, reference, mp.mpf(float(p[0])), mp.mpf(float(p[1])))
            for p in points]


def in_turn(*sources):
    """The rows of several functions."""
    for source in sources:
        yield from source()


def relative(truth, got):
    return np.array([abs(float((mp.mpf(float(g)) - t) / t)) if np.isfinite(g) else np.nan
                     for t, g in zip(truth, got)])
