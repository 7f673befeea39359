#!/usr/bin/env python3
"""Prints the examples of tests/systems/methods_test.cpp that PROJ cannot vouch for, at 40 digits.

Formulas of IOGP Publication 373-7-2 for methods 9803, 1028, 9817, 9816 and 9830, written here with
meridian arcs by quadrature and isometric latitudes in closed form, no series anywhere.
"""

from mpmath import atanh, cos, exp, mp, mpf, nstr, pi, quad, sin, sqrt, tan

mp.dps = 50


def dms(d, m, s):
    sign = -1 if str(d).startswith('-') else 1
    return sign * (abs(mpf(d)) + mpf(m) / 60 + mpf(s) / 3600)


def rad(degrees):
    return mpf(degrees) * pi / 180


class Ellipsoid:
    def __init__(self, a, rf):
        self.a = mpf(a)
        f = 1 / mpf(rf)
        self.e2 = f * (2 - f)
        self.e = sqrt(self.e2)

    def nu(self, lat):
        return self.a / sqrt(1 - self.e2 * sin(lat)**2)

    def rho(self, lat):
        return self.a * (1 - self.e2) / (1 - self.e2 * sin(lat)**2)**mpf('1.5')

    def arc(self, lat):
        return quad(self.rho, [0, lat / 2, lat])

    def t(self, lat):
        return exp(-(atanh(sin(lat)) - self.e * atanh(self.e * sin(lat))))

    def m(self, lat):
        return cos(lat) * self.nu(lat) / self.a


INTERNATIONAL = Ellipsoid('6378388', '297')
WGS84 = Ellipsoid('6378137', '298.257223563')
CLARKE = Ellipsoid('6378249.2', mpf('6378249.2') / (mpf('6378249.2') - 6356515))


def belgium(lon, lat):
    E = INTERNATIONAL
    lat1, lat2 = rad(dms(49, 50, 0)), rad(dms(51, 10, 0))
    n = mp.log(E.m(lat1) / E.m(lat2)) / mp.log(E.t(lat1) / E.t(lat2))
    F = E.m(lat1) / (n * E.t(lat1)**n)
    r = E.a * F * E.t(rad(lat))**n
    theta = n * rad(lon - dms(4, 21, mpf('24.983'))) - rad(mpf('29.2985') / 3600)
    return mpf('150000.01256') + r * sin(theta), mpf('5400088.4378') - r * cos(theta)


def equidistant(lon, lat):
    return WGS84.a * rad(lon), WGS84.arc(rad(lat))


def levant(lon, lat):
    E = CLARKE
    lat0, k0 = rad(mpf('34.65')), mpf('0.9996256')
    m = E.arc(rad(lat)) - E.arc(lat0)
    M = k0 * (m + m**3 / (6 * E.rho(lat0) * E.nu(lat0)))
    r = k0 * E.nu(lat0) / tan(lat0) - M
    theta = rad(lon - mpf('37.35')) * sin(lat0)
    return 300000 + r * sin(theta), 300000 + M + r * sin(theta) * tan(theta / 2)


def tunisia(lon, lat):
    """Grads of Paris; kilometres."""
    up = mpf('0.010015') if lat > mpf('36.5964') else mpf('0.01002')
    return 270 + (lon - mpf('7.83445')) / mpf('0.012185'), 360 + (lat - mpf('36.5964')) / up


def adelie(lon, lat):
    E = INTERNATIONAL
    lat_f = rad(-67)
    r = E.a * E.m(lat_f) * E.t(-rad(lat)) / E.t(-lat_f)
    r_f = E.a * E.m(lat_f)
    theta = rad(lon - 140)
    return 300000 + r * sin(theta), 200000 - r_f + r * cos(theta)


for name, work, lon, lat in (
        ('31300', belgium, dms(5, 48, mpf('26.533')), dms(50, 40, mpf('46.461'))),
        ('4087', equidistant, mpf(10), mpf(55)),
        ('22700', levant, dms(34, 8, mpf('11.291')), dms(37, 31, mpf('17.625'))),
        ('22300', tunisia, mpf('8.22437'), mpf('38.97997')),
        ('2985', adelie, dms(140, 4, mpf('17.040')), dms(-66, 36, mpf('18.820')))):
    x, y = work(lon, lat)
    print(f'{name}: {nstr(x, 16)} {nstr(y, 16)}')
