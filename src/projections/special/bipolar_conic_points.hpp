// Formulas of the bipolar oblique conic conformal projection of the sphere: two oblique conics,
// with poles A and B, joined along the great circle through the poles. O. M. Miller and W. A.
// Briesemeister, A new conformal projection for Europe and the Americas, Geographical Review 31
// (1941), pp. 100-104; J. P. Snyder, Map Projections: A Working Manual, USGS Professional Paper
// 1395 (1987), pp. 116-123, eq. 17-1 to 17-36.
#pragma once

#include "formulas/constants.hpp"
#include "points/elementary.hpp"
#include "points/over_points.hpp"

namespace tidewater::detail {

// The cosine of the largest arc that the projection reaches from its pole.
inline constexpr double kBipolarReach = -0.27531253;

struct BipolarPole {
  double lon, sin, cos;

  template <Number V>
  TW_INLINE V cos_arc(const SinCos<V>& d, const SinCos<V>& lat) const {
    return lat.cos * d.cos * cos + lat.sin * sin;
  }
  // Azimuth at the pole of a point d of longitude away.
  template <Number V>
  TW_INLINE V azimuth(const SinCos<V>& d, V tan_lat) const {
    const V north = tan_lat * cos - d.cos * sin;
    return select((d.sin == 0.0) & (north == 0.0), 0.0, atan2(d.sin, north));
  }
};

// A point as seen from the pole of its side.
template <class V>
struct BipolarSight {
  V cos_z;      // of the arc to the pole
  V azimuth_b;  // at B
  SinCos<V> d_a;
  V tan_lat;
  Mask<V> b_side;
};
template <Number V>
TW_INLINE BipolarSight<V> bipolar_sight(const BipolarPole& a, const BipolarPole& b, double az_ba,
                                        V lon, V lat) {
  const auto d_a = sincos(lon - a.lon);
  const auto d_b = sincos(b.lon - lon);
  const auto p = sincos(lat);
  const V tan_lat = p.sin / p.cos;
  const V azimuth = b.azimuth(d_b, tan_lat);
  const auto b_side = azimuth <= az_ba;
  return {select(b_side, b.cos_arc(d_b, p), a.cos_arc(d_a, p)), azimuth, d_a, tan_lat, b_side};
}

// tan(z / 2)^n by the square of the tangent.
template <Number V>
TW_INLINE V power_of_square(V square_of_tangent, double n) {
  return exp(log(square_of_tangent) * (0.5 * n));
}

struct BipolarCone {
  BipolarPole a, b;
  double az_ab, az_ba, n, t, rho_c, f;
  double tan_half_ab, sin_c, cos_c;

  // Half the angle of the gore that is closed at the arc z from the pole: tan_z is tan(z / 2),
  // power its n-th power.
  template <Number V>
  TW_INLINE V cosine_of_gore(V tan_z, V power) const {
    const V other = (tan_half_ab - tan_z) / (1.0 + tan_half_ab * tan_z);
    return (power_of_square(other * other, n) + power) * (1 / t);
  }
};

struct BipolarForward {
  BipolarCone cone;

  template <Number V>
  TW_INLINE Answer<V> operator()(V lon, V lat) const {
    const auto at = bipolar_sight(cone.a, cone.b, cone.az_ba, lon, lat);
    const Mask<V> plain = !(at.cos_z < kBipolarReach);
    const V tan2 = (1.0 - at.cos_z) / (1.0 + at.cos_z);
    const V power = power_of_square(tan2, cone.n);
    const V al = acos(cone.cosine_of_gore(sqrt(tan2), power));
    const V w = select(at.b_side, cone.az_ba - at.azimuth_b,
                       cone.az_ab - cone.a.azimuth(at.d_a, at.tan_lat)) *
                cone.n;
    const V fan = sincos(select(at.b_side, al - w, w + al)).cos;
    const V r = cone.f * power / select(abs(w) < al, fan, 1.0);
    const auto turn = sincos(w);
    const V x1 = r * turn.sin;
    const V north = r * turn.cos - cone.rho_c;
    const V y1 = select(at.b_side, north, -north);
    return {-(cone.cos_c * x1) - cone.sin_c * y1, -(cone.cos_c * y1) + cone.sin_c * x1, plain};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

struct BipolarInverse {
  BipolarCone cone;
  double lon_c;

  template <Number V>
  TW_INLINE Answer<V> operator()(V x, V y) const {
    constexpr int kMostPasses = 30;
    constexpr double kSecondOfArc = 4.848136811e-6;
    const V x1 = cone.sin_c * y - cone.cos_c * x;
    const V y1 = -(cone.sin_c * x) - cone.cos_c * y;
    const auto a_side = x1 < 0.0;
    const V u = cone.rho_c + select(a_side, -y1, y1);
    const V r0 = sqrt(u * u + x1 * x1);
    const V w = atan2(x1, u);
    V r = r0;
    V tan_z = 0.0;
    Mask<V> moving = everywhere<V>(true);
    Mask<V> plain = everywhere<V>(true);
    for (int pass = 0; pass < kMostPasses && any(moving); ++pass) {
      const V power = r * (1 / cone.f);
      tan_z = select(moving, exp(log(power) * (1 / cone.n)), tan_z);
      const V g = cone.cosine_of_gore(tan_z, power);
      const auto outside = (g < -1.0) | (g > 1.0);
      plain = plain & !(moving & outside);
      const V al = acos(g);
      moving = moving & !outside & !(abs(w) >= al);
      const V next = sincos(select(a_side, w + al, al - w)).cos * r0;
      const V step = abs(next - r);
      r = select(moving, next, r);
      moving = moving & !(step <= 1e-10);
    }
    const auto azimuth = sincos(select(a_side, V(cone.az_ab), V(cone.az_ba)) - w * (1 / cone.n));
    const V sin_p = select(a_side, V(cone.a.sin), V(cone.b.sin));
    const V cos_p = select(a_side, V(cone.a.cos), V(cone.b.cos));
    const V t2 = tan_z * tan_z;
    const V over = 1.0 / (1.0 + t2);
    const V sin_z = 2.0 * tan_z * over;
    const V cos_z = (1.0 - t2) * over;
    const V east = azimuth.sin * sin_z;
    const V north = cos_p * cos_z - azimuth.cos * sin_z * sin_p;
    const V d = atan2(east, north);
    const V lat =
        atan2(azimuth.cos * sin_z * cos_p + cos_z * sin_p, sqrt(east * east + north * north));
    const V lon = select(a_side, d + cone.a.lon, cone.b.lon - d);
    return {select(abs(abs(lat) - kHalfPi) <= kSecondOfArc, lon_c, lon), lat, plain};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

struct BipolarScale {
  BipolarPole a, b;
  double az_ba, n, f, k0;

  template <Number V>
  TW_INLINE Answer3<V> operator()(V lon, V lat) const {
    const V c = bipolar_sight(a, b, az_ba, lon, lat).cos_z;
    const Mask<V> plain = !(c < kBipolarReach);
    const V k =
        f * power_of_square((1.0 - c) / (1.0 + c), n) * (n * k0) / sqrt((1.0 - c) * (1.0 + c));
    return {k, k, k * k, plain};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

}  // namespace tidewater::detail

TIDEWATER_INSTANCE(tidewater::detail::BipolarForward)
TIDEWATER_INSTANCE(tidewater::detail::BipolarInverse)
TIDEWATER_INSTANCE(tidewater::detail::BipolarScale)
