"""Trigonometric series whose coefficients are power series with rational coefficients.

A series is a sum over k of P_k w^k with w = exp(i x), real P_k (lists of fractions: the powers of a
small quantity up to ORDER), times 1/i where it is odd.  Products, derivatives and substitutions stay
exact, so that the coefficients printed from them are those of the mathematics and of nobody's table.
"""
from fractions import Fraction

ORDER = 8


def p_zero():
    return [Fraction(0)] * (ORDER + 1)


def p_const(c):
    p = p_zero()
    p[0] = Fraction(c)
    return p


def p_mul(p, q):
    r = p_zero()
    for i, a in enumerate(p):
        if a:
            for j in range(ORDER + 1 - i):
                if q[j]:
                    r[i + j] += a * q[j]
    return r


def p_add(p, q):
    return [a + b for a, b in zip(p, q)]


def p_scale(c, p):
    return [c * a for a in p]


def p_inverse(p):
    """1/p for p with p[0] != 0."""
    r = p_zero()
    for k in range(ORDER + 1):
        s = Fraction(1 if k == 0 else 0) - sum(p[j] * r[k - j] for j in range(1, k + 1))
        r[k] = s / p[0]
    return r


def p_power(p, k):
    r = p_const(1)
    for _ in range(k):
        r = p_mul(r, p)
    return r


class Series:
    def __init__(self, terms=None, odd=False):
        self.terms = {k: p for k, p in (terms or {}).items() if any(p)}
        self.odd = odd

    def __add__(self, other):
        if not other.terms:
            return self
        if not self.terms:
            return other
        assert self.odd == other.odd
        terms = dict(self.terms)
        for k, p in other.terms.items():
            terms[k] = p_add(terms[k], p) if k in terms else p
        return Series(terms, self.odd)

    def __mul__(self, other):
        terms = {}
        sign = -1 if self.odd and other.odd else 1
        for k, p in self.terms.items():
            for l, q in other.terms.items():
                r = p_mul(p, q)
                if any(r):
                    r = p_scale(sign, r) if sign < 0 else r
                    terms[k + l] = p_add(terms[k + l], r) if k + l in terms else r
        return Series(terms, self.odd != other.odd)

    def scaled(self, factor):
        """Times a number or a power series."""
        if not isinstance(factor, list):
            factor = p_const(factor)
        return Series({k: p_mul(factor, p) for k, p in self.terms.items()}, self.odd)

    def derivative(self):
        sign = 1 if self.odd else -1
        return Series({k: p_scale(sign * k, p) for k, p in self.terms.items()}, not self.odd)

    def sine(self, k):
        """The coefficient of sin(k x), a power series."""
        assert self.odd
        return p_scale(2, self.terms.get(k, p_zero()))

    def cosine(self, k):
        assert not self.odd or not self.terms
        return p_scale(1 if k == 0 else 2, self.terms.get(k, p_zero()))


def sine(k, coefficient=1):
    """coefficient * sin(k x)"""
    c = coefficient if isinstance(coefficient, list) else p_const(coefficient)
    return Series({k: p_scale(Fraction(1, 2), c), -k: p_scale(Fraction(-1, 2), c)}, True)


def cosine(k, coefficient=1):
    c = coefficient if isinstance(coefficient, list) else p_const(coefficient)
    if k == 0:
        return Series({0: c})
    return Series({k: p_scale(Fraction(1, 2), c), -k: p_scale(Fraction(1, 2), c)})


def factorial(k):
    return k * factorial(k - 1) if k else 1


def shifted(f, delta):
    """f(x + delta(x)) for a small delta, by Taylor's series."""
    result = f
    power = delta
    g = f
    for k in range(1, ORDER + 1):
        g = g.derivative()
        result = result + (g * power).scaled(Fraction(1, factorial(k)))
        power = power * delta
    return result


def reverted(delta):
    """epsilon with x = y + epsilon(y) where y = x + delta(x)."""
    epsilon = delta.scaled(-1)
    for _ in range(ORDER):
        epsilon = shifted(delta, epsilon).scaled(-1)
    return epsilon


def composed(first, second):
    """z - x for y = x + first(x), z = y + second(y)."""
    return first + shifted(second, first)
