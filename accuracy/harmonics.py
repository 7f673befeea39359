"""The geomagnetic field by its definition, in 30 digits.

V = a sum (a/r)^(n+1) sum (g cos m lon + h sin m lon) P_n^m(cos theta), Schmidt semi-normalised, and
the field is its gradient downwards (R. A. Langel, The Main Field, in Geomagnetism 1, 1987, eq. 1).
The Legendre functions come from the derivatives of (x^2 - 1)^n as polynomials, by no recursion.
"""

import csv
from functools import lru_cache

import mpmath as mp


def coefficients(path):
    """{epoch: {(n, m): (g, h)}} of a table of IAGA's form, rows n, m with m below 0 for h."""
    with open(path, newline="") as file:
        rows = list(csv.reader(file))
    epochs = [float(text) for text in rows[0][2:]]
    sets = {epoch: {} for epoch in epochs}
    for row in rows[1:]:
        n, m = int(row[0]), int(row[1])
        for epoch, text in zip(epochs, row[2:]):
            g, h = sets[epoch].get((n, abs(m)), (mp.mpf(0), mp.mpf(0)))
            sets[epoch][n, abs(m)] = (g, mp.mpf(text)) if m < 0 else (mp.mpf(text), h)
    return sets


def between(sets, date):
    """The coefficients of a date, linear between two epochs."""
    epochs = sorted(sets)
    last = max(i for i, epoch in enumerate(epochs[:-1]) if epoch <= date)
    low, high = epochs[last], epochs[last + 1]
    share = (mp.mpf(date) - low) / (high - low)
    return {key: tuple(a + (b - a) * share for a, b in zip(sets[low][key], sets[high][key]))
            for key in sets[low]}


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
