"""Map projections by their definitions, in 50 digits.

Each maker takes parameters in radians and gives a function (lon, lat) -> (x, y) in units of the
semi-major axis.  The formulas are those of J. P. Snyder, Map Projections: A Working Manual, USGS
Professional Paper 1395 (1987), in their closed forms: where Snyder gives a series, the integral or the
complex function that it stands for is taken.  Nothing here comes from the library's sources.
"""

import mpmath as mp

mp.mp.dps = 50
PI = mp.pi


# --- auxiliary latitudes -----------------------------------------------------------------------


def isometric(e, lat):
    """Snyder 1987, eq. 3-1 and 7-7: ln tan(pi/4 + chi/2)."""
    s = mp.sin(lat)
    return mp.asinh(mp.tan(lat)) - (e * mp.atanh(e * s) if e else 0)


def conformal(e, lat):
    return mp.atan(mp.sinh(isometric(e, lat)))


def geodetic(e, psi):
    """The latitude, perhaps complex, of an isometric latitude: Newton's steps."""
    lat = mp.atan(mp.sinh(psi))
    for _ in range(100):
        s = mp.sin(lat)
        step = (isometric(e, lat) - psi) * (1 - e * e * s * s) * mp.cos(lat) / (1 - e * e)
        lat -= step
        if abs(step) < mp.mpf(10) ** (-45):
            return lat
    raise ValueError("no latitude")


def arc(e, lat):
    """Meridian arc from the equator: an elliptic integral of the second kind."""
    if not e:
        return lat
    s, c = mp.sin(lat), mp.cos(lat)
    return mp.ellipe(lat, e * e) - e * e * s * c / mp.sqrt(1 - e * e * s * s)


def authalic(e, lat):
    """q of Snyder 1987, eq. 3-12."""
    s = mp.sin(lat)
    if not e:
        return 2 * s
    return (1 - e * e) * (s / (1 - e * e * s * s) + mp.atanh(e * s) / e)


def nu(e, lat):
    return 1 / mp.sqrt(1 - (e * mp.sin(lat)) ** 2)


def rho(e, lat):
    return (1 - e * e) * nu(e, lat) ** 3


def parallel(e, lat):
    return nu(e, lat) * mp.cos(lat)


# --- cylinders ---------------------------------------------------------------------------------


def mercator(e, lon0, lat0):
    y0 = isometric(e, lat0)
    return lambda lon, lat: (lon - lon0, isometric(e, lat) - y0)


def miller(lon0, lat0):
    y = lambda lat: mp.log(mp.tan(PI / 4 + 2 * lat / 5)) * 5 / 4
    return lambda lon, lat: (lon - lon0, y(lat) - y(lat0))


def equirectangular(e, lon0, lat0, lat1):
    k = parallel(e, lat1)
    return lambda lon, lat: (k * (lon - lon0), arc(e, lat) - arc(e, lat0))


def transverse_mercator(e, lon0, lat0):
    """The meridian arc of the complex latitude (Krueger 1912)."""
    m0 = arc(e, lat0)

    def forward(lon, lat):
        z = arc(e, geodetic(e, mp.mpc(isometric(e, lat), lon - lon0)))
        return z.imag, z.real - m0

    return forward


def gauss_sphere(e, lat0):
    """Ratio, shift and radius of the conformal sphere that fits lat0, and the mapping."""
    c = mp.sqrt(1 + (e * mp.cos(lat0) ** 2) ** 2 / (1 - e * e))
    chi0 = mp.asin(mp.sin(lat0) / c)
    t = isometric(0, chi0) / c - isometric(e, lat0)
    radius = mp.sqrt(rho(e, lat0) * nu(e, lat0))
    mapping = lambda lon, lat: (c * lon, mp.atan(mp.sinh(c * (isometric(e, lat) + t))))
    return c, t, radius, chi0, mapping


def cylindrical_equal_area(e, lon0, lat1):
    k = parallel(e, lat1)
    return lambda lon, lat: (k * (lon - lon0), authalic(e, lat) / (2 * k))


def _oblique_rotated(u, v, angle):
    return (v * mp.cos(angle) + u * mp.sin(angle), u * mp.cos(angle) - v * mp.sin(angle))


def _aposphere(e, lat0):
    b = mp.sqrt(1 + e * e * mp.cos(lat0) ** 4 / (1 - e * e))
    a = b * mp.sqrt(1 - e * e) * nu(e, lat0) ** 2
    d = b * mp.sqrt(1 - e * e) * nu(e, lat0) / mp.cos(lat0)
    return a, b, d


def hotine(e, lon_c, lat_c, azimuth, rectified=None):
    """Hotine's oblique Mercator (Snyder 1987, eq. 9-11 to 9-34), from the natural origin."""
    a, b, d = _aposphere(e, lat_c)
    sign = -1 if lat_c < 0 else 1
    f = d + sign * mp.sqrt(d * d - 1)
    constant = mp.log(f) - b * isometric(e, lat_c)  # of the isometric latitude
    gamma = mp.asin(mp.sin(azimuth) / d)
    lon0 = lon_c - mp.asin((f - 1 / f) / 2 * mp.tan(gamma)) / b
    return _skew(e, a, b, constant, lon0, gamma, azimuth if rectified is None else rectified)


def _skew(e, a, b, constant, lon0, gamma, rectified):
    def forward(lon, lat):
        q = mp.exp(b * isometric(e, lat) + constant)
        s, t = (q - 1 / q) / 2, (q + 1 / q) / 2
        v1 = mp.sin(b * (lon - lon0))
        u1 = (-v1 * mp.cos(gamma) + s * mp.sin(gamma)) / t
        v = a * mp.log((1 - u1) / (1 + u1)) / (2 * b)
        u = a / b * mp.atan2(s * mp.cos(gamma) + v1 * mp.sin(gamma), mp.cos(b * (lon - lon0)))
        return _oblique_rotated(u, v, rectified)

    return forward


def two_point(e, lat_c, lat1, lon1, lat2, lon2):
    """The oblique Mercator through two points (Snyder 1987, eq. 9-11 to 9-13, 9-15 to 9-24)."""
    a, b, d = _aposphere(e, lat_c)
    sign = -1 if lat_c < 0 else 1
    constant = mp.log(d + sign * mp.sqrt(d * d - 1)) - b * isometric(e, lat_c)
    h, l, big_e = (mp.exp(-b * isometric(e, lat1)), mp.exp(-b * isometric(e, lat2)), mp.exp(constant))
    f = big_e / h
    j = (big_e ** 2 - l * h) / (big_e ** 2 + l * h)
    p = (l - h) / (l + h)
    lon0 = (lon1 + lon2) / 2 - mp.atan(j * mp.tan(b * (lon1 - lon2) / 2) / p) / b
    gamma = mp.atan(2 * mp.sin(b * (lon1 - lon0)) / (f - 1 / f))
    return _skew(e, a, b, constant, lon0, gamma, mp.asin(d * mp.sin(gamma)))


def swiss(e, lon0, lat0):
    """Rosenmund 1903: the conformal sphere, and its oblique Mercator through the origin."""
    _, _, radius, chi0, mapping = gauss_sphere(e, lat0)

    def forward(lon, lat):
        l, b = mapping(lon - lon0, lat)
        u = mp.asin(mp.cos(chi0) * mp.sin(b) - mp.sin(chi0) * mp.cos(b) * mp.cos(l))
        v = mp.asin(mp.cos(b) * mp.sin(l) / mp.cos(u))
        return radius * v, radius * isometric(0, u)

    return forward


def rectified_skew(e, lon_c, lat_c, skew):
    """Hotine's rectified skew orthomorphic: the line's angle at the equator is given."""
    a, b, d = _aposphere(e, lat_c)
    constant = mp.acosh(d) * (-1 if lat_c < 0 else 1) - b * isometric(e, lat_c)
    s = mp.sinh(b * isometric(e, lat_c) + constant)
    lon0 = lon_c - mp.asin(s * mp.tan(skew)) / b
    return _skew(e, a, b, constant, lon0, skew, skew)


def laborde(e, lon0, lat0, azimuth):
    """Gauss sphere, its transverse Mercator, a complex cubic; in units of the sphere's radius."""
    c, t, _, chi0, mapping = gauss_sphere(e, lat0)
    plane = transverse_mercator(0, 0, chi0)
    cubic = mp.mpc(1 - mp.cos(2 * azimuth), mp.sin(2 * azimuth)) / 12

    def forward(lon, lat):
        x, y = plane(*mapping(lon - lon0, lat))
        w = mp.mpc(y, x)
        z = w + cubic * w ** 3
        return z.imag, z.real

    return forward


NZMG = [mp.mpc(*pair) for pair in (
    ("0.7557853228", "0"), ("0.249204646", "0.003371507"), ("-0.001541739", "0.041058560"),
    ("-0.10162907", "0.01727609"), ("-0.26623489", "-0.36249218"), ("-0.6870983", "-1.1651967"))]


def new_zealand(e, lon0, lat0):
    """Reilly 1973: a complex polynomial of the Mercator plane."""
    def forward(lon, lat):
        z = mp.mpc(isometric(e, lat) - isometric(e, lat0), lon - lon0)
        w = sum(b * z ** (k + 1) for k, b in enumerate(NZMG))
        return w.imag, w.real

    return forward


# --- cones -------------------------------------------------------------------------------------


def cone(radius, n, lon0, lat0):
    def forward(lon, lat):
        r, theta = radius(lat), n * (lon - lon0)
        return r * mp.sin(theta), radius(lat0) - r * mp.cos(theta)

    return forward


def lambert_conformal(e, lon0, lat0, lat1, lat2):
    if lat1 == lat2:
        n = mp.sin(lat1)
    else:
        n = mp.log(parallel(e, lat1) / parallel(e, lat2)) / (isometric(e, lat2) - isometric(e, lat1))
    f = parallel(e, lat1) / n * mp.exp(n * isometric(e, lat1))
    return cone(lambda lat: f * mp.exp(-n * isometric(e, lat)), n, lon0, lat0)


def albers(e, lon0, lat0, lat1, lat2):
    m1, q1 = parallel(e, lat1) ** 2, authalic(e, lat1)
    if lat1 == lat2:
        n = mp.sin(lat1)
    else:
        n = (m1 - parallel(e, lat2) ** 2) / (authalic(e, lat2) - q1)
    c = m1 + n * q1
    return cone(lambda lat: mp.sqrt(c - n * authalic(e, lat)) / n, n, lon0, lat0)


def equidistant_conic(e, lon0, lat0, lat1, lat2):
    if lat1 == lat2:
        n = mp.sin(lat1)
    else:
        n = (parallel(e, lat1) - parallel(e, lat2)) / (arc(e, lat2) - arc(e, lat1))
    g = parallel(e, lat1) / n + arc(e, lat1)
    return cone(lambda lat: g - arc(e, lat), n, lon0, lat0)


def near_conformal(e, lon0, lat0, k0):
    """Lambert's near-conformal cone: EPSG Guidance Note 7-2, method 9817, the arc exact."""
    third = 1 / (6 * rho(e, lat0) * nu(e, lat0))
    r0 = k0 * nu(e, lat0) * mp.cot(lat0)

    def forward(lon, lat):
        m = arc(e, lat) - arc(e, lat0)
        along = k0 * (m + third * m ** 3)
        theta = (lon - lon0) * mp.sin(lat0)
        x = (r0 - along) * mp.sin(theta)
        return x, along + x * mp.tan(theta / 2)

    return forward


def oblique_lambert(e, lon0, lat0, d1, d2, pole_lon, pole_lat):
    """A cone about a pole: the conformal sphere, turned, and Lambert's cone, in the sphere's radius."""
    _, _, _, _, mapping = gauss_sphere(e, lat0 + (d1 + d2) / 2)
    turn = rotated(*mapping(pole_lon, pole_lat))
    o_lon, o_lat = turn(*mapping(lon0, lat0))
    plane = lambert_conformal(0, 0, o_lat, o_lat + d1, o_lat + d2)

    def forward(lon, lat):
        l, p = turn(*mapping(lon, lat))
        d = l - o_lon
        return plane(d - 2 * PI * mp.floor(d / (2 * PI) + mp.mpf(1) / 2), p)

    return forward


def polyconic(e, lon0, lat0):
    m0 = arc(e, lat0)

    def forward(lon, lat):
        if lat == 0:
            return lon - lon0, -m0
        angle = (lon - lon0) * mp.sin(lat)
        r = nu(e, lat) * mp.cot(lat)
        return r * mp.sin(angle), arc(e, lat) - m0 + r * (1 - mp.cos(angle))

    return forward


def bonne(e, lon0, lat1):
    r1 = nu(e, lat1) * mp.cot(lat1)

    def forward(lon, lat):
        r = r1 + arc(e, lat1) - arc(e, lat)
        angle = parallel(e, lat) * (lon - lon0) / r
        return r * mp.sin(angle), r1 - r * mp.cos(angle)

    return forward


def rotated(pole_lon, pole_lat):
    """Longitude from the new pole's meridian, the side of the old pole at pi, and latitude."""
    def turn(lon, lat):
        d = lon - pole_lon
        s = mp.sin(pole_lat) * mp.sin(lat) + mp.cos(pole_lat) * mp.cos(lat) * mp.cos(d)
        east = mp.cos(lat) * mp.sin(d)
        south = mp.sin(pole_lat) * mp.cos(lat) * mp.cos(d) - mp.cos(pole_lat) * mp.sin(lat)
        return mp.atan2(east, south), mp.asin(s)

    return turn


def krovak(e):
    """EPSG Guidance Note 7-2, method 9819, on Bessel 1841: southing and westing are -y and -x."""
    lat_c, lon_0 = mp.radians(mp.mpf("49.5")), mp.radians(24 + mp.mpf(50) / 60)
    colat = mp.radians(30 + mp.mpf(17) / 60 + mp.mpf("17.30311") / 3600)
    lat_p, k = mp.radians(mp.mpf("78.5")), mp.mpf("0.9999")
    c, t, radius, _, mapping = gauss_sphere(e, lat_c)
    n = mp.sin(lat_p)
    r0 = k * radius * mp.cot(lat_p)

    def forward(lon, lat):
        v, u = mapping(lon_0 - lon, lat)
        s = mp.asin(mp.cos(colat) * mp.sin(u) + mp.sin(colat) * mp.cos(u) * mp.cos(v))
        d = mp.asin(mp.cos(u) * mp.sin(v) / mp.cos(s))
        theta = n * d
        r = r0 * (mp.tan(PI / 4 + lat_p / 2) / mp.tan(s / 2 + PI / 4)) ** n
        return -r * mp.sin(theta), -r * mp.cos(theta)

    return forward


def modified_krovak(e, a):
    """EPSG Guidance Note 7-2, method 1042: a polynomial of degree four taken off Krovak's plane."""
    c = [None] + [mp.mpf(v) for v in (
        "2.946529277e-2", "2.515965696e-2", "1.193845912e-7", "-4.668270147e-7", "9.233980362e-12",
        "1.523735715e-12", "1.696780024e-18", "4.408314235e-18", "-8.331083518e-24",
        "-3.689471323e-24")]
    plane = krovak(e)

    def forward(lon, lat):
        westing, southing = (-v * a for v in plane(lon, lat))
        x, y = southing - 1089000, westing - 654000
        dx = (c[1] + c[3] * x - c[4] * y - 2 * c[6] * x * y + c[5] * (x * x - y * y)
              + c[7] * x * (x * x - 3 * y * y) - c[8] * y * (3 * x * x - y * y)
              + 4 * c[9] * x * y * (x * x - y * y)
              + c[10] * (x ** 4 + y ** 4 - 6 * x * x * y * y))
        dy = (c[2] + c[3] * y + c[4] * x + 2 * c[5] * x * y + c[6] * (x * x - y * y)
              + c[8] * x * (x * x - 3 * y * y) + c[7] * y * (3 * x * x - y * y)
              - 4 * c[10] * x * y * (x * x - y * y)
              + c[9] * (x ** 4 + y ** 4 - 6 * x * x * y * y))
        return (dy - westing) / a, (dx - southing) / a

    return forward


def bipolar(scaled=False):
    """The map of the Americas, a sphere of radius 1 (Snyder 1987, eq. 17-1 to 17-22)."""
    deg = PI / 180
    lat_a, lon_a, lat_b, apart, z1, z2 = (v * deg for v in (-20, -110, 45, 104, 31, 73))
    lon_b = lon_a + mp.acos((mp.cos(apart) - mp.sin(lat_a) * mp.sin(lat_b))
                            / (mp.cos(lat_a) * mp.cos(lat_b)))
    n = mp.log(mp.sin(z1) / mp.sin(z2)) / mp.log(mp.tan(z1 / 2) / mp.tan(z2 / 2))
    size = mp.sin(z1) / (n * mp.tan(z1 / 2) ** n)
    total = mp.tan(z1 / 2) ** n + mp.tan(z2 / 2) ** n
    rho_c = size * total / 2
    z_c = 2 * mp.atan((total / 2) ** (1 / n))
    k0 = 2 / (1 + n * size * mp.tan(26 * deg) ** n / mp.sin(52 * deg)) if scaled else 1

    def from_pole(lat_p, lon_p, lat, lon):
        d = lon - lon_p
        z = mp.acos(mp.sin(lat_p) * mp.sin(lat) + mp.cos(lat_p) * mp.cos(lat) * mp.cos(d))
        return z, mp.atan2(mp.sin(d) * mp.cos(lat), mp.cos(lat_p) * mp.sin(lat)
                           - mp.sin(lat_p) * mp.cos(lat) * mp.cos(d))

    az_ab = from_pole(lat_a, lon_a, lat_b, lon_b)[1]  # eastward from north
    az_ba = -from_pole(lat_b, lon_b, lat_a, lon_a)[1]  # westward
    lat_c = mp.asin(mp.sin(lat_a) * mp.cos(z_c) + mp.cos(lat_a) * mp.sin(z_c) * mp.cos(az_ab))
    az_c = mp.asin(mp.cos(lat_a) * mp.sin(az_ab) / mp.cos(lat_c))

    def forward(lon, lat):
        z, east = from_pole(lat_b, lon_b, lat, lon)
        west = -east
        by_b = west <= az_ba
        if by_b:
            turn = n * (az_ba - west)
        else:
            z, east = from_pole(lat_a, lon_a, lat, lon)
            turn = n * (az_ab - east)
        r = size * mp.tan(z / 2) ** n
        cosine = (mp.tan(z / 2) ** n + mp.tan((apart - z) / 2) ** n) / total
        alpha = mp.acos(min(cosine, mp.mpf(1)))
        if abs(turn) < alpha:
            r /= mp.cos(alpha - turn if by_b else alpha + turn)
        x, y = r * mp.sin(turn), (r if by_b else -r) * mp.cos(turn)
        y += -rho_c if by_b else rho_c
        return k0 * (-x * mp.cos(az_c) - y * mp.sin(az_c)), k0 * (-y * mp.cos(az_c) + x * mp.sin(az_c))

    return forward


def imw(e, lon0, lat1):
    """Modified polyconic of the International Map of the World (Snyder 1987, eq. 18-1 to 18-16)."""
    degree = PI / 180
    lat2 = lat1 + 4 * degree
    size = max(abs(lat1), abs(lat2))
    # the two true meridians stand 2, 4 or 8 degrees from the central one
    width = (2 if lat1 < 60 * degree - mp.mpf(10) ** -9 else
             4 if lat1 < 76 * degree - mp.mpf(10) ** -9 else 8) * degree

    def edge(lat):
        if lat == 0:
            return width, mp.mpf(0), None
        r = nu(e, lat) * mp.cot(lat)
        f = width * mp.sin(lat)
        return r * mp.sin(f), r * (1 - mp.cos(f)), r

    x1, t1, r1 = edge(lat1)
    x2, t2, r2 = edge(lat2)
    m1, m2 = arc(e, lat1), arc(e, lat2)
    y1 = t1
    y2 = mp.sqrt((m2 - m1) ** 2 - (x2 - x1) ** 2) + y1
    c2 = y2 - t2
    big_p = (m2 * y1 - m1 * y2) / (m2 - m1)
    big_q = (y2 - y1) / (m2 - m1)
    p1 = (m2 * x1 - m1 * x2) / (m2 - m1)
    q1 = (x2 - x1) / (m2 - m1)

    def forward(lon, lat):
        d = lon - lon0
        m = arc(e, lat)
        xa, ya = p1 + q1 * m, big_p + big_q * m
        r = nu(e, lat) * mp.cot(lat) if lat else None
        c = ya - r + mp.sqrt(r * r - xa * xa) if r else ya
        if r is not None and lat < 0:
            c = ya - r - mp.sqrt(r * r - xa * xa)

        def along(radius, lat_e, offset):
            if radius is None:
                return d, offset
            f = d * mp.sin(lat_e)
            return radius * mp.sin(f), offset + radius * (1 - mp.cos(f))

        xb, yb = along(r2, lat2, c2)
        xc, yc = along(r1, lat1, mp.mpf(0))
        slope = (xb - xc) / (yb - yc)
        base = xc + slope * (c - yc)
        if r is None:
            return xc + slope * (c - yc), c
        # the circle of radius r round (0, c + r) meets the straight meridian
        b = base + slope * r
        side = -1 if lat > 0 else 1
        x = (b + side * slope * mp.sqrt(r * r * (1 + slope * slope) - b * b)) / (1 + slope * slope)
        return x, c + r + side * mp.sqrt(r * r - x * x)

    return forward


# --- azimuthal ---------------------------------------------------------------------------------


def stereographic(e, lon0, lat0):
    if abs(abs(lat0) - PI / 2) < mp.mpf(10) ** -14:
        sign = 1 if lat0 > 0 else -1
        size = 2 / mp.sqrt((1 + e) ** (1 + e) * (1 - e) ** (1 - e))

        def polar(lon, lat):
            r = size * mp.exp(-isometric(e, sign * lat))
            return r * mp.sin(lon - lon0), -sign * r * mp.cos(lon - lon0)

        return polar
    chi1 = conformal(e, lat0)
    size = 2 * parallel(e, lat0) / mp.cos(chi1)

    def oblique(lon, lat):
        chi, d = conformal(e, lat), lon - lon0
        k = size / (1 + mp.sin(chi1) * mp.sin(chi) + mp.cos(chi1) * mp.cos(chi) * mp.cos(d))
        return (k * mp.cos(chi) * mp.sin(d),
                k * (mp.cos(chi1) * mp.sin(chi) - mp.sin(chi1) * mp.cos(chi) * mp.cos(d)))

    return oblique


def double_stereographic(e, lon0, lat0):
    """In units of the conformal sphere's radius."""
    _, _, _, chi0, mapping = gauss_sphere(e, lat0)
    plane = stereographic(0, 0, chi0)
    return lambda lon, lat: plane(*mapping(lon - lon0, lat))


def azimuthal_equal_area(e, lon0, lat0):
    qp = authalic(e, PI / 2)
    if abs(abs(lat0) - PI / 2) < mp.mpf(10) ** -12:
        sign = 1 if lat0 > 0 else -1

        def polar(lon, lat):
            r = mp.sqrt(qp - sign * authalic(e, lat))
            return r * mp.sin(lon - lon0), -sign * r * mp.cos(lon - lon0)

        return polar
    beta1 = mp.asin(authalic(e, lat0) / qp)
    rq = mp.sqrt(qp / 2)
    d = parallel(e, lat0) / (rq * mp.cos(beta1))

    def oblique(lon, lat):
        beta, l = mp.asin(authalic(e, lat) / qp), lon - lon0
        b = rq * mp.sqrt(2 / (1 + mp.sin(beta1) * mp.sin(beta)
                              + mp.cos(beta1) * mp.cos(beta) * mp.cos(l)))
        return (b * d * mp.cos(beta) * mp.sin(l),
                b / d * (mp.cos(beta1) * mp.sin(beta) - mp.sin(beta1) * mp.cos(beta) * mp.cos(l)))

    return oblique


def azimuthal_equidistant_sphere(lon0, lat0):
    def forward(lon, lat):
        d = lon - lon0
        c = mp.acos(mp.sin(lat0) * mp.sin(lat) + mp.cos(lat0) * mp.cos(lat) * mp.cos(d))
        k = c / mp.sin(c) if c else 1
        return (k * mp.cos(lat) * mp.sin(d),
                k * (mp.cos(lat0) * mp.sin(lat) - mp.sin(lat0) * mp.cos(lat) * mp.cos(d)))

    return forward


def gnomonic(lon0, lat0):
    def forward(lon, lat):
        d = lon - lon0
        c = mp.sin(lat0) * mp.sin(lat) + mp.cos(lat0) * mp.cos(lat) * mp.cos(d)
        return (mp.cos(lat) * mp.sin(d) / c,
                (mp.cos(lat0) * mp.sin(lat) - mp.sin(lat0) * mp.cos(lat) * mp.cos(d)) / c)

    return forward


def geocentric(e, lon, lat, height=0):
    n = nu(e, lat)
    return ((n + height) * mp.cos(lat) * mp.cos(lon), (n + height) * mp.cos(lat) * mp.sin(lon),
            (n * (1 - e * e) + height) * mp.sin(lat))


def local(e, lon0, lat0, lon, lat, height=0, height0=0):
    """East, north, up of a point seen from an origin."""
    d = [p - q for p, q in zip(geocentric(e, lon, lat, height), geocentric(e, lon0, lat0, height0))]
    s, c, sl, cl = mp.sin(lat0), mp.cos(lat0), mp.sin(lon0), mp.cos(lon0)
    return (-sl * d[0] + cl * d[1], -s * cl * d[0] - s * sl * d[1] + c * d[2],
            c * cl * d[0] + c * sl * d[1] + s * d[2])


def orthographic(e, lon0, lat0):
    return lambda lon, lat: local(e, lon0, lat0, lon, lat)[:2]


def perspective(e, lon0, lat0, h):
    """From a point h above the origin onto the tangent plane; h in units of the axis."""
    def forward(lon, lat):
        east, north, up = local(e, lon0, lat0, lon, lat)
        k = h / (h - up)
        return k * east, k * north

    return forward


def tilted_perspective(lon0, lat0, h, tilt, azimuth):
    """On a camera's plane, of the sphere (Snyder 1987, eq. 23-3 and 23-11 to 23-13)."""
    vertical = perspective(0, lon0, lat0, h)

    def forward(lon, lat):
        x, y = vertical(lon, lat)
        up = y * mp.cos(azimuth) + x * mp.sin(azimuth)
        size = up * mp.sin(tilt) / h + mp.cos(tilt)
        return (x * mp.cos(azimuth) - y * mp.sin(azimuth)) * mp.cos(tilt) / size, up / size

    return forward


# --- series that define a method of the registry (EPSG Guidance Note 7-2) ----------------------


def cassini_series(e, lon0, lat0, hyperbolic=False):
    """Methods 9806 and 9833."""
    def forward(lon, lat):
        t, c = mp.tan(lat) ** 2, e * e * mp.cos(lat) ** 2 / (1 - e * e)
        a = (lon - lon0) * mp.cos(lat)
        x = nu(e, lat) * (a - t * a ** 3 / 6 - (8 - t + 8 * c) * t * a ** 5 / 120)
        y = arc(e, lat) - arc(e, lat0) + nu(e, lat) * mp.tan(lat) * (
            a ** 2 / 2 + (5 - t + 6 * c) * a ** 4 / 24)
        return x, y - y ** 3 / (6 * rho(e, lat) * nu(e, lat)) if hyperbolic else y

    return forward


def modified_equidistant(e, lon0, lat0):
    """Method 9832."""
    n0 = nu(e, lat0)
    g = e * mp.sin(lat0) / mp.sqrt(1 - e * e)

    def forward(lon, lat):
        d = lon - lon0
        psi = mp.atan((1 - e * e) * mp.tan(lat)
                      + e * e * n0 * mp.sin(lat0) / (nu(e, lat) * mp.cos(lat)))
        alpha = mp.atan2(mp.sin(d), mp.cos(lat0) * mp.tan(psi) - mp.sin(lat0) * mp.cos(d))
        h = e * mp.cos(lat0) * mp.cos(alpha) / mp.sqrt(1 - e * e)
        s = mp.asin(mp.sin(d) * mp.cos(psi) / mp.sin(alpha))
        c = n0 * s * (1 - s ** 2 * h ** 2 * (1 - h ** 2) / 6
                      + s ** 3 / 8 * g * h * (1 - 2 * h ** 2)
                      + s ** 4 / 120 * (h ** 2 * (4 - 7 * h ** 2) - 3 * g ** 2 * (1 - 7 * h ** 2))
                      - s ** 5 / 48 * g * h)
        return c * mp.sin(alpha), c * mp.cos(alpha)

    return forward


def guam(e, lon0, lat0):
    """Method 9831."""
    def forward(lon, lat):
        x = nu(e, lat) * mp.cos(lat) * (lon - lon0)
        return x, arc(e, lat) - arc(e, lat0) + x * x * mp.tan(lat) / (2 * nu(e, lat))

    return forward


def colombia_urban(e, lon0, lat0, h):
    """Method 1052; h in units of the axis."""
    def forward(lon, lat):
        east = nu(e, lat) * mp.cos(lat) * (lon - lon0)
        b = mp.tan(lat0) / (2 * rho(e, lat0) * nu(e, lat0))
        g = 1 + h / rho(e, (lat + lat0) / 2)
        return (1 + h / nu(e, lat0)) * east, g * rho(e, lat0) * (lat - lat0 + b * east ** 2)

    return forward


# --- world maps --------------------------------------------------------------------------------


def sinusoidal(e, lon0, lat0=0):
    return lambda lon, lat: (parallel(e, lat) * (lon - lon0), arc(e, lat) - arc(e, lat0))


def _root(f, slope, start):
    x = start
    for _ in range(400):
        step = f(x) / slope(x)
        x -= step
        if abs(step) < mp.mpf(10) ** -45:
            return x
    return x


def mollweide(lon0):
    def forward(lon, lat):
        t = _root(lambda t: t + mp.sin(t) - PI * mp.sin(lat), lambda t: 1 + mp.cos(t), lat) / 2
        return mp.sqrt(8) / PI * (lon - lon0) * mp.cos(t), mp.sqrt(2) * mp.sin(t)

    return forward


def eckert4(lon0):
    def forward(lon, lat):
        t = _root(lambda t: t + mp.sin(t) * mp.cos(t) + 2 * mp.sin(t) - (2 + PI / 2) * mp.sin(lat),
                  lambda t: 2 * mp.cos(t) * (1 + mp.cos(t)), lat / 2)
        return (2 / mp.sqrt(PI * (4 + PI)) * (lon - lon0) * (1 + mp.cos(t)),
                2 * mp.sqrt(PI / (4 + PI)) * mp.sin(t))

    return forward


def van_der_grinten(lon0):
    def forward(lon, lat):
        d = lon - lon0
        s = abs(2 * lat / PI)
        c = mp.sqrt(1 - s * s)
        a = abs(PI / d - d / PI) / 2
        g = c / (s + c - 1)
        p = g * (2 / s - 1)
        q = a * a + g
        p2 = p * p + a * a
        x = PI * (a * (g - p * p) + mp.sqrt((a * (g - p * p)) ** 2 - p2 * (g * g - p * p))) / p2
        y = PI * (p * q - a * mp.sqrt((a * a + 1) * p2 - q * q)) / p2
        return mp.sign(d) * abs(x), mp.sign(lat) * abs(y)

    return forward


def equal_earth(e, lon0):
    a = [mp.mpf(t) for t in ("1.340264", "-0.081106", "0.000893", "0.003796")]
    qp = authalic(e, PI / 2)
    rq = mp.sqrt(qp / 2)

    def forward(lon, lat):
        t = mp.asin(mp.sqrt(3) / 2 * authalic(e, lat) / qp)
        slope = a[0] + 3 * a[1] * t ** 2 + t ** 6 * (7 * a[2] + 9 * a[3] * t ** 2)
        y = t * (a[0] + a[1] * t ** 2 + t ** 6 * (a[2] + a[3] * t ** 2))
        return rq * 2 * mp.sqrt(3) * (lon - lon0) * mp.cos(t) / (3 * slope), rq * y

    return forward


# --- the track of a satellite --------------------------------------------------------------------


class SpaceOblique:
    """Snyder 1987, eq. 27-1 to 27-16, of a circular orbit: his series are the integrals' own."""

    def __init__(self, e, inclination, ratio, node):
        e2, s = e * e, mp.sin(inclination)
        self.e2, self.s, self.c, self.p, self.node = e2, s, mp.cos(inclination), ratio, node
        self.j = (1 - e2) ** 3
        self.w = ((1 - e2 * self.c ** 2) / (1 - e2)) ** 2 - 1
        self.q = e2 * s * s / (1 - e2)
        self.t = e2 * s * s * (2 - e2) / (1 - e2) ** 2

    def terms(self, angle):
        s2 = mp.sin(angle) ** 2
        one, two = 1 + self.q * s2, 1 + self.w * s2
        big_s = self.p * self.s * mp.cos(angle) * mp.sqrt((1 + self.t * s2) / (two * one))
        big_h = mp.sqrt(one / two) * (two / one ** 2 - self.p * self.c)
        return big_s, big_h, mp.sqrt(self.j ** 2 + big_s ** 2)

    def along_and_across(self, lon, lat, start):
        """Angle along the orbit, near start, and the distance from the track on the map."""
        tangent = (1 - self.e2) * self.s * mp.tan(lat)
        angle = start
        for _ in range(500):
            turned = lon - self.node + self.p * angle
            way = mp.atan2(self.c * mp.sin(turned) + tangent, mp.cos(turned))
            way += 2 * PI * mp.nint((angle - way) / (2 * PI))
            step, angle = abs(way - angle), way
            if step < mp.mpf(10) ** -40:
                break
        sine = ((1 - self.e2) * self.c * mp.sin(lat) - self.s * mp.cos(lat) * mp.sin(turned))
        return angle, mp.atanh(sine / mp.sqrt(1 - self.e2 * mp.sin(lat) ** 2))

    def forward(self, lon, lat, start):
        return self.plane(*self.along_and_across(lon, lat, start))

    def plane(self, angle, offset):
        big_s, _, size = self.terms(angle)

        def along(v):
            s, h, d = self.terms(v)
            return (h * self.j - s * s) / d

        def across(v):
            s, h, d = self.terms(v)
            return s * (h + self.j) / d

        pieces = [angle * k / 4 for k in range(5)]
        return (mp.quad(along, pieces) - big_s / size * offset,
                mp.quad(across, pieces) + self.j / size * offset)


class RolledTrack(SpaceOblique):
    """The same plane, on which the track bends as it bends on the ground.

    Snyder 1981 (USGS Bulletin 1518), the general orbit: the direction of the track's image is the
    integral of its geodesic curvature, the image that of its direction.  The curvature is taken from
    the ellipsoid itself, by Liouville's formula; integrals by their Fourier series, whose terms fall
    below the last digit.
    """

    SAMPLES = 96

    def __init__(self, e, inclination, ratio, node):
        super().__init__(e, inclination, ratio, node)
        angles = [2 * PI * j / self.SAMPLES for j in range(self.SAMPLES)]
        speed = [mp.hypot(*self.terms(v)[:2]) for v in angles]
        self.turning = self._series([self._bend(v) for v in angles])
        assert abs(self.turning[0]) < mp.mpf(10) ** -40  # the track closes on a circular orbit
        way = [self.direction(v) for v in angles]
        self.east = self._series([v * mp.sin(t) for v, t in zip(speed, way)])
        self.north = self._series([v * mp.cos(t) for v, t in zip(speed, way)])

    def _ground(self, angle):
        """Velocity towards east and north of the point below the satellite; latitude, its meridian's."""
        g = 1 - self.e2
        e = mp.sqrt(self.e2)
        geocentric_lat = mp.asin(self.s * mp.sin(angle))
        c2 = mp.cos(geocentric_lat) ** 2
        lat = mp.atan(mp.tan(geocentric_lat) / g)
        lon_rate = self.c / c2 - self.p
        lat_rate = mp.cos(lat) ** 2 / (g * c2) * self.s * mp.cos(angle) / mp.sqrt(c2)
        return parallel(e, lat) * lon_rate, rho(e, lat) * lat_rate, mp.sin(lat) * lon_rate

    def _bend(self, angle):
        """How fast the track turns to its right."""
        east, north, meridian = self._ground(angle)
        d_east = mp.diff(lambda v: self._ground(v)[0], angle)
        d_north = mp.diff(lambda v: self._ground(v)[1], angle)
        return (d_east * north - east * d_north) / (east ** 2 + north ** 2) - meridian

    def _series(self, values):
        """Mean, cosine and sine coefficients of samples of a period."""
        n = len(values)
        unit = [mp.expjpi(mp.mpf(2 * j) / n) for j in range(n)]
        terms = [2 * sum(v * unit[j * k % n] for j, v in enumerate(values)) / n
                 for k in range(1, n // 2)]
        return [sum(values) / n, [t.real for t in terms], [t.imag for t in terms]]

    @staticmethod
    def _integral(series, angle):
        mean, cosines, sines = series
        return mean * angle + sum((c * mp.sin(k * angle) + s * (1 - mp.cos(k * angle))) / k
                                  for k, (c, s) in enumerate(zip(cosines, sines), 1))

    def direction(self, angle):
        """Of the track's image, to the right of the second axis."""
        return self._integral(self.turning, angle)

    def plane(self, angle, offset):
        big_s, big_h, _ = self.terms(angle)
        size, turn = mp.hypot(big_s, big_h), self.direction(angle)
        left = (big_h * mp.cos(turn) - big_s * mp.sin(turn)) / size
        ahead = (big_s * mp.cos(turn) + big_h * mp.sin(turn)) / size
        x = self._integral(self.east, angle) - offset * left
        y = self._integral(self.north, angle) + offset * ahead
        m_x, m_y = self.east[0], self.north[0]
        return (x * m_x + y * m_y) / mp.hypot(m_x, m_y), (y * m_x - x * m_y) / mp.hypot(m_x, m_y)


# --- distortion --------------------------------------------------------------------------------


def distortion(e, forward, lon, lat):
    """Scale along the meridian and the parallel, the largest and the smallest; by differences."""
    h = mp.mpf(10) ** -16
    east = [(b - a) / (2 * h) for a, b in zip(forward(lon - h, lat), forward(lon + h, lat))]
    north = [(b - a) / (2 * h) for a, b in zip(forward(lon, lat - h), forward(lon, lat + h))]
    east = [v / parallel(e, lat) for v in east]
    north = [v / rho(e, lat) for v in north]
    area = abs(east[0] * north[1] - east[1] * north[0])
    square = sum(v * v for v in east + north)
    both = mp.sqrt(square + 2 * area)
    apart = mp.sqrt(max(square - 2 * area, mp.mpf(0)))
    return {"h": mp.hypot(*north), "k": mp.hypot(*east), "most": (both + apart) / 2,
            "least": (both - apart) / 2, "area": area}
