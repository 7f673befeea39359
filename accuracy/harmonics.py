"""The geomagnetic field by its definition, in 30 digits.

V = a sum (a/r)^(n+1) sum (g cos m lon + h sin m lon) P_n^m(cos theta), Schmidt semi-normalised, and
the field is its gradient downwards (R. A. Langel, The Main Field, in Geomagnetism 1, 1987, eq. 1).
The Legendre functions come from the derivatives of (x^2 - 1)^n as polynomials, by no recursion.
"""

import csv
from functools import lru_cache

import mpmath as mp


def rows_of(path):
    """The rows of a table of the store's sources, by the names of the columns."""
    with open(path, newline="") as file:
        return list(csv.DictReader(line for line in file if not line.startswith("#")))


def of_store(data, name, date):
    """The coefficients of a date, {(n, m): (g, h)}, of a model of the folder data/."""
    model = next(row for row in rows_of(data / "magnetic_models.csv") if row["model name"] == name)
    files = {row["table"]: row["file"] for row in rows_of(data / "tables.csv")}
    epochs = rows_of(data / files[model["epoch table"]])

    def read(epoch):
        return {(int(row["n"]), int(row["m"])): (mp.mpf(row["C"]), mp.mpf(row["S"]))
                for row in rows_of(data / files[epoch["coefficient table"]]) if row["n"] != "0"}

    # the last set holds the yearly rates of the one before it
    sets = {float(epoch["Epoch date"]): read(epoch) for epoch in epochs[:-1]}
    end, newest = float(epochs[-1]["Epoch date"]), max(sets)
    rates = read(epochs[-1])
    sets[end] = {key: tuple(a + b * (end - newest) for a, b in zip(value, rates[key]))
                 for key, value in sets[newest].items()}
    return between(sets, date)


def between(sets, date):
    """The coefficients of a date, linear between two epochs."""
    epochs = sorted(sets)
    last = max(i for i, epoch in enumerate(epochs[:-1]) if epoch <= date)
    low, high = epochs[last], epochs[last + 1]
    share = (mp.mpf(date) - low) / (high - low)
    none = (mp.mpf(0), mp.mpf(0))
    return {key: tuple(a + (b - a) * share for a, b in
                       zip(sets[low].get(key, none), sets[high].get(key, none)))
            for key in set(sets[low]) | set(sets[high])}


@lru_cache(maxsize=None)
def polynomial(n, m):
    """Coefficients of the (n + m)-th derivative of (x^2 - 1)^n / (2^n n!), by power of x."""
    powers = {2 * k: mp.binomial(n, k) * (-1) ** (n - k) for k in range(n + 1)}
    for _ in range(n + m):
        powers = {p - 1: c * p for p, c in powers.items() if p > 0}
    size = 2 ** n * mp.factorial(n)
    return {p: c / size for p, c in powers.items()}


def legendre(n, m, theta):
    """P_n^m(cos theta), Schmidt semi-normalised, and its derivative by theta."""
    c, s = mp.cos(theta), mp.sin(theta)
    terms = polynomial(n, m)
    value = sum(k * c ** p for p, k in terms.items())
    slope = sum(k * p * c ** (p - 1) for p, k in terms.items() if p > 0)
    norm = mp.mpf(1) if m == 0 else mp.sqrt(2 * mp.factorial(n - m) / mp.factorial(n + m))
    p_m = s ** m
    derivative = (m * s ** (m - 1) * c * value if m > 0 else 0) - p_m * s * slope
    return norm * p_m * value, norm * derivative


def field(model, lon, lat, height, radius=6371200, a=6378137, inverse_f="298.257223563"):
    """North, east, down in nT at degrees and metres on the ellipsoid of a and f."""
    lon, lat = mp.radians(mp.mpf(lon)), mp.radians(mp.mpf(lat))
    f = 1 / mp.mpf(inverse_f)
    e2 = f * (2 - f)
    nu = a / mp.sqrt(1 - e2 * mp.sin(lat) ** 2)
    rho = (nu + height) * mp.cos(lat)
    z = (nu * (1 - e2) + height) * mp.sin(lat)
    r, theta = mp.hypot(rho, z), mp.atan2(rho, z)
    up = south = east = mp.mpf(0)
    for (n, m), (g, h) in model.items():
        p, dp = legendre(n, m, theta)
        ratio = (radius / r) ** (n + 2)
        along = g * mp.cos(m * lon) + h * mp.sin(m * lon)
        up += (n + 1) * ratio * along * p
        south -= ratio * along * dp
        east += ratio * m * (g * mp.sin(m * lon) - h * mp.cos(m * lon)) * p / mp.sin(theta)
    psi = lat - (mp.pi / 2 - theta)
    north = -south * mp.cos(psi) - up * mp.sin(psi)
    down = -up * mp.cos(psi) + south * mp.sin(psi)
    return north, east, down
