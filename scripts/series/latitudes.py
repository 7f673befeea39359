"""Writes src/formulas/latitude_coefficients.hpp: auxiliary latitudes into each other.

Each series eta = zeta + sum over k of C_k sin(2 k zeta), C_k a polynomial in the third flattening n.
Definitions after C. F. F. Karney, On auxiliary latitudes, Survey Review 56 (2023), section 2; the
coefficients are worked out here from the definitions.  Also the series of the rhumb line's area
(C. F. F. Karney, The area of rhumb polygons, Studia Geophysica et Geodaetica 68 (2024), section 4).

    python3 scripts/series/latitudes.py > src/formulas/latitude_coefficients.hpp
"""
from fractions import Fraction

from trigonometric import *

N = p_zero()
N[1] = Fraction(1)
ONE = p_const(1)
# e^2 = 4 n / (1 + n)^2
E2 = p_mul(p_scale(4, N), p_inverse(p_power(p_add(ONE, N), 2)))


def reduced():
    """beta - phi: tan beta = (1 - n) / (1 + n) tan phi"""
    s = Series(odd=True)
    for k in range(1, ORDER + 1):
        s = s + sine(2 * k, p_scale(Fraction((-1) ** k, k), p_power(N, k)))
    return s


def binomial_half(j):
    r = Fraction(1)
    for i in range(j):
        r *= (Fraction(1, 2) - i) / (i + 1)
    return r


def rectifying_of_reduced():
    """mu - beta: dm / d beta is proportional to |1 - n exp(2 i beta)|"""
    cosines = []
    for k in range(ORDER + 1):
        p = p_zero()
        for j in range(ORDER + 1):
            if 2 * j + k <= ORDER:
                p[2 * j + k] += (binomial_half(j) * binomial_half(j + k) * (-1) ** k *
                                 (1 if k == 0 else 2))
        cosines.append(p)
    scale = p_inverse(cosines[0])
    s = Series(odd=True)
    for k in range(1, ORDER + 1):
        s = s + sine(2 * k, p_scale(Fraction(1, 2 * k), p_mul(cosines[k], scale)))
    return s


def conformal():
    """chi - phi: the isometric latitude is less than the sphere's by e artanh(e sin phi)"""
    sigma = Series(odd=True)
    s1 = sine(1)
    power = s1
    for j in range(ORDER):
        sigma = sigma + power.scaled(p_scale(Fraction(-1, 2 * j + 1), p_power(E2, j + 1)))
        power = power * s1 * s1
    c1 = cosine(1)
    d = c1  # the k-th derivative of the gudermannian, as a function of phi
    power = sigma
    result = Series(odd=True)
    for k in range(1, ORDER + 1):
        result = result + (d * power).scaled(Fraction(1, factorial(k)))
        d = c1 * d.derivative()
        power = power * sigma
    return result


def poly_mul(a, b):
    r = {}
    for i, p in a.items():
        for j, q in b.items():
            t = p_mul(p, q)
            if any(t):
                r[i + j] = p_add(r[i + j], t) if i + j in r else t
    return r


def poly_add(a, b):
    r = dict(a)
    for i, p in b.items():
        r[i] = p_add(r[i], p) if i in r else p
    return r


def authalic():
    """xi - phi: sin xi = q(phi) / q(90 degrees), all as polynomials in s = sin phi"""
    q = {2 * j + 1: p_scale(Fraction(2 * j + 2, 2 * j + 1), p_power(E2, j))
         for j in range(ORDER + 1)}
    total = p_zero()
    for p in q.values():
        total = p_add(total, p)
    u = {k: p_mul(p, p_inverse(total)) for k, p in q.items()}
    u[1] = p_add(u[1], p_const(-1))
    # v = u / (1 - s^2), from the lowest power
    v = {}
    rest = dict(u)
    for k in sorted(u):
        if k not in rest or not any(rest[k]) or k > 2 * ORDER:
            continue
        v[k] = rest.pop(k)
        rest[k + 2] = p_add(rest.get(k + 2, p_zero()), v[k])
    derivative = {0: p_const(1)}  # of the arc sine, times (1 - s^2)^(k - 1/2)
    power = v
    total = {}
    for k in range(1, ORDER + 1):
        term = poly_mul(power, derivative)
        total = poly_add(total, {i: p_scale(Fraction(1, factorial(k)), p) for i, p in term.items()})
        slope = {i - 1: p_scale(i, p) for i, p in derivative.items() if i}
        slope = poly_mul(slope, {0: p_const(1), 2: p_const(-1)})
        derivative = poly_add(slope, poly_mul(derivative, {1: p_const(2 * k - 1)}))
        power = poly_mul(power, v)
    result = Series(odd=True)
    s = cosine(1)
    last = 0
    for i in sorted(total):
        while last < i:
            s = s * sine(1)
            last += 1
        result = result + s.scaled(total[i])
    return result


def rhumb_area(authalic_of_conformal):
    """P_k: the integral of (sin xi - sin chi) / cos chi over chi is the sum of P_k cos(2 k chi)."""
    # sin(chi + d) - sin chi, d = sum of C_k sin(2 k chi), every term of it divisible by cos chi.
    difference = shifted(sine(1), authalic_of_conformal) + sine(1, -1)
    # Division by cos chi = (w + 1/w) / 2, from the highest power.
    rest = {k: list(p) for k, p in difference.terms.items()}
    quotient = {}
    while any(any(p) for p in rest.values()):
        k = max(k for k, p in rest.items() if any(p))
        c = p_scale(2, rest[k])
        quotient[k - 1] = c
        rest[k] = p_zero()
        rest[k - 2] = p_add(rest.get(k - 2, p_zero()), p_scale(Fraction(-1, 2), c))
        assert k > -60
    q = Series(quotient, True)
    return [p_scale(Fraction(-1, 2 * k), q.sine(2 * k)) for k in range(1, ORDER + 1)]


def number(c):
    if c.denominator == 1:
        return str(c.numerator) + "."
    return f"{c.numerator}. / {c.denominator}"


def table(name, comment, rows):
    print(f"\n// {comment}")
    print(f"inline constexpr LatitudeCoefficients {name} = {{{{")
    for k, p in enumerate(rows, 1):
        assert not any(p[:k])
        print("    {" + ", ".join(number(c) for c in p[k:]) + "},")
    print("}};")


def main():
    beta = reduced()
    latitudes = {
        "Geodetic": Series(odd=True),
        "Reduced": beta,
        "Rectifying": composed(beta, rectifying_of_reduced()),
        "Conformal": conformal(),
        "Authalic": authalic(),
    }
    print("// Written by scripts/series/latitudes.py: coefficients of the series between latitudes, worked")
    print("// out from the latitudes' definitions with rational numbers.")
    print("#pragma once\n")
    print("namespace tidewater::detail {\n")
    print("// Row k - 1 holds the polynomial of sin(2 k latitude), from n^k to n^8.")
    print("struct LatitudeCoefficients {")
    print(f"  double row[{ORDER}][{ORDER}];")
    print("};")
    for a, from_geodetic in latitudes.items():
        to_geodetic = reverted(from_geodetic)
        for b, series in latitudes.items():
            if a == b:
                continue
            s = composed(to_geodetic, series)
            table(f"k{b}From{a}", f"{b} latitude from {a.lower()}",
                  [s.sine(2 * k) for k in range(1, ORDER + 1)])
    xi_of_chi = composed(reverted(latitudes["Conformal"]), latitudes["Authalic"])
    table("kRhumbArea", "The integral of (sin xi - sin chi) / cos chi: of cos(2 k chi)",
          rhumb_area(xi_of_chi))
    print("\n}  // namespace tidewater::detail")


main()
