"""Writes src/formulas/geodesic_coefficients.hpp: the series of geodesics on an ellipsoid.

The integrals of C. F. F. Karney, Algorithms for geodesics, Journal of Geodesy 87 (2013), pp. 43-55,
eqs 15-25 and 58-63, worked out with rational numbers in the expansion parameter eps, with
k^2 = 4 eps / (1 - eps)^2, and in the third flattening n.

    python3 scripts/series/geodesics.py > src/formulas/geodesic_coefficients.hpp
"""
from fractions import Fraction

import trigonometric
from trigonometric import Series, p_const, p_inverse, p_mul, p_scale, p_zero, reverted, sine

ORDER = 6
trigonometric.ORDER = ORDER


def binomial(a, j):
    r = Fraction(1)
    for i in range(j):
        r *= (a - i) / Fraction(i + 1)
    return r


def powers_of_distance(a):
    """Fourier coefficients of |1 - eps exp(2 i sigma)|^(2 a), power series in eps."""
    cosines = []
    for k in range(ORDER + 1):
        p = p_zero()
        for j in range(ORDER + 1):
            if 2 * j + k <= ORDER:
                p[2 * j + k] += (binomial(a, j) * binomial(a, j + k) * (-1) ** k *
                                 (1 if k == 0 else 2))
        cosines.append(p)
    return cosines


def length_series(a):
    """Mean without its factor (1 - eps)^(-2 a), and the series over the mean."""
    cosines = powers_of_distance(a)
    inverse = p_inverse(cosines[0])
    s = Series(odd=True)
    for k in range(1, ORDER + 1):
        s = s + sine(2 * k, p_scale(Fraction(1, 2 * k), p_mul(cosines[k], inverse)))
    return cosines[0], s


# Polynomials in eps and n, {(i, j): c} for eps^i n^j, as coefficients of z^k, z = exp(2 i sigma).

def mul2(p, q):
    r = {}
    for (i, j), a in p.items():
        for (k, l), b in q.items():
            if i + j + k + l <= ORDER:
                r[i + k, j + l] = r.get((i + k, j + l), 0) + a * b
    return r


def add2(p, q, c=1):
    r = dict(p)
    for k, b in q.items():
        r[k] = r.get(k, 0) + c * b
    return r


def mul_z(p, q):
    r = {}
    for k, a in p.items():
        for l, b in q.items():
            r[k + l] = add2(r.get(k + l, {}), mul2(a, b))
    return r


def add_z(p, q, c=1):
    r = dict(p)
    for k, b in q.items():
        r[k] = add2(r.get(k, {}), b, c)
    return r


ONE2 = {(0, 0): Fraction(1)}
EPS = {(1, 0): Fraction(1)}
N = {(0, 1): Fraction(1)}


def distance_z(a):
    z = {}
    for k, p in enumerate(powers_of_distance(a)):
        c = {(i, 0): v / (1 if k == 0 else 2) for i, v in enumerate(p) if v}
        z[k] = c
        z[-k] = c
    return z


def longitude_integrand():
    """(2 - f) / (1 + (1 - f) sqrt(1 + k^2 sin^2 sigma))
    = 2 (1 - eps) / ((1 + n) (1 - eps) + (1 - n) |1 - eps z|)"""
    whole = mul_z({0: add2(ONE2, N, -1)}, distance_z(Fraction(1, 2)))
    whole = add_z(whole, {0: mul2(add2(ONE2, N), add2(ONE2, EPS, -1))})
    half = {k: {e: v / 2 for e, v in p.items()} for k, p in whole.items()}
    u = add_z(half, {0: ONE2}, -1)
    inverse = {0: ONE2}
    power = {0: ONE2}
    for k in range(1, ORDER + 1):
        power = mul_z(power, u)
        inverse = add_z(inverse, power, (-1) ** k)
    return mul_z({0: add2(ONE2, EPS, -1)}, inverse)


def area_integrand():
    """(t(x) - t(y)) / (x - y), x = e'^2 = 4 n / (1 - n)^2, y = k^2 sin^2 sigma, as series in z."""
    t = series_t(ORDER + 2)

    def small(q):
        c = {0: {}}
        for m in range(1, ORDER + 1):
            c[0] = add2(c[0], {(m if q is EPS else 0, m if q is N else 0): Fraction(4 * m)})
        return c

    x = small(N)
    k2 = small(EPS)
    # sin^2 sigma = (2 - z - 1/z) / 4
    y = mul_z(k2, {0: {(0, 0): Fraction(1, 2)}, 1: {(0, 0): Fraction(-1, 4)},
                   -1: {(0, 0): Fraction(-1, 4)}})
    xs = [{0: ONE2}]
    ys = [{0: ONE2}]
    for _ in range(ORDER + 1):
        xs.append(mul_z(xs[-1], x))
        ys.append(mul_z(ys[-1], y))
    total = {}
    for m in range(1, ORDER + 2):
        for i in range(m):
            total = add_z(total, mul_z(xs[i], ys[m - 1 - i]), t[m])
    return total


def series_t(order):
    """t(x) = x + sqrt(1 + 1/x) arsinh(sqrt x), by multiplying the two binomial series."""
    # arsinh(u)/u = sum of binomial(-1/2, j) u^(2 j) / (2 j + 1)
    a = [binomial(Fraction(-1, 2), j) / (2 * j + 1) for j in range(order + 1)]
    r = [binomial(Fraction(1, 2), j) for j in range(order + 1)]
    t = [sum(a[i] * r[k - i] for i in range(k + 1)) for k in range(order + 1)]
    t[1] += 1
    return t


def number(c):
    c = Fraction(c)
    if c.denominator == 1:
        return str(c.numerator) + "."
    return f"{c.numerator}. / {c.denominator}"


def print_mean(name, comment, p):
    print(f"\n// {comment}")
    values = ", ".join(number(p[k]) for k in range(0, ORDER + 1, 2))
    print(f"inline constexpr double {name}[{ORDER // 2 + 1}] = {{{values}}};")


def print_series(name, comment, s):
    print(f"\n// {comment}")
    print(f"inline constexpr double {name}[{ORDER}][{ORDER // 2}] = {{")
    for k in range(1, ORDER + 1):
        p = s.sine(2 * k)
        print("    {" + ", ".join(number(p[i]) for i in range(k, ORDER + 1, 2)) + "},")
    print("};")


def print_double(name, comment, rows):
    size = ORDER
    print(f"\n// {comment}")
    print(f"inline constexpr double {name}[{len(rows)}][{size}][{size}] = {{")
    for p in rows:
        print("    {")
        for i in range(size):
            line = [number(p.get((i, j), 0)) for j in range(size) if i + j < ORDER]
            print("        {" + ", ".join(line) + "},")
        print("    },")
    print("};")


def main():
    print("// Written by scripts/series/geodesics.py: the series of geodesics, worked out with rational")
    print("// numbers from their integrals.")
    print("#pragma once\n")
    print("namespace tidewater::detail {")
    mean, lengths = length_series(Fraction(1, 2))
    print_mean("kGeodesicA1", "The mean of I1 times (1 - eps): powers of eps^2", mean)
    print_series("kGeodesicC1", "I1 over its mean: row l - 1 belongs to sin(2 l sigma), from eps^l on "
                 "in steps of eps^2", lengths)
    print_series("kGeodesicC1Reverted", "The same reverted: sigma from tau", reverted(lengths))
    mean, lengths = length_series(Fraction(-1, 2))
    print_mean("kGeodesicA2", "The mean of I2 over (1 - eps): powers of eps^2", mean)
    print_series("kGeodesicC2", "I2 over its mean", lengths)
    z = longitude_integrand()
    rows = [z[0]]
    for l in range(1, ORDER):
        rows.append({e: v / l for e, v in z[l].items()})  # 2 z_l cos(2 l sigma), over 2 l
    print_double("kGeodesicI3", "I3: row 0 its mean, row l of sin(2 l sigma); [eps][n]", rows)
    total = area_integrand()
    # times sin(sigma) / 2: cos(2 l s) sin(s) = (sin((2 l + 1) s) - sin((2 l - 1) s)) / 2
    sines = [{} for _ in range(ORDER + 1)]
    for l in range(ORDER + 1):
        c = {e: v * (1 if l == 0 else 2) for e, v in total.get(l, {}).items()}
        if l == 0:
            sines[0] = add2(sines[0], c, Fraction(1, 2))
        else:
            sines[l] = add2(sines[l], c, Fraction(1, 4))
            sines[l - 1] = add2(sines[l - 1], c, Fraction(-1, 4))
    rows = [{e: v / (2 * l + 1) for e, v in sines[l].items()} for l in range(ORDER)]
    print_double("kGeodesicI4", "I4: row l of cos((2 l + 1) sigma); [eps][n]", rows)
    print("\n}  // namespace tidewater::detail")


main()
