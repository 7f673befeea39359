// Rhumb lines on an ellipsoid of revolution: direct and inverse problems and the area under a line,
// several lines at once.
// C. F. F. Karney, The area of rhumb polygons, Studia Geophysica et Geodaetica 68 (2024), pp.
// 99-120: divided differences of the auxiliary latitudes keep parallels and lines close to them as
// exact as the rest.  Coefficients by scripts/series/latitudes.py.
//
// A line runs straight in isometric latitude psi and longitude; along it the meridian's arc, the
// rectifying latitude mu, grows in proportion to its length.
#pragma once

#include "formulas/degrees.hpp"
#include "formulas/latitudes.hpp"

namespace tidewater::detail {

struct RhumbLines {
  double a, e2, radius, authalic2;  // radius: of the rectifying sphere
  LatitudeSeries to_conformal, to_rectifying, from_rectifying, to_authalic, area_terms;

  RhumbLines(double semi_major, double f)
      : a(semi_major),
        e2(f * (2 - f)),
        radius(rectifying_radius(semi_major, f)),
        authalic2(authalic_radius_squared(semi_major, f)),
        to_conformal(kConformalFromGeodetic, third_flattening(f)),
        to_rectifying(kRectifyingFromGeodetic, third_flattening(f)),
        from_rectifying(kGeodeticFromRectifying, third_flattening(f)),
        to_authalic(kAuthalicFromGeodetic, third_flattening(f)),
        area_terms(kRhumbArea, third_flattening(f)) {}

  // sin and cos of 2 k (mean) and 2 k (half difference), k from 1 to 8, in sums over a series:
  // the difference of the sine series and of the cosine series between two angles, and the mean of
  // the sine series.
  template <Number V>
  struct Sums {
    V sine_difference, sine_mean, cosine_difference;
  };
  template <Number V>
  TW_INLINE static Sums<V> sums(const LatitudeSeries& series, SinCos<V> mean, SinCos<V> half) {
    const auto m = twice(mean);
    const auto h = twice(half);
    SinCos<V> m_before = {0.0, 1.0};
    SinCos<V> h_before = {0.0, 1.0};
    SinCos<V> m_now = m;
    SinCos<V> h_now = h;
    Sums<V> out = {0.0, 0.0, 0.0};
    for (int k = 0; k < 8; ++k) {
      out.sine_difference = out.sine_difference + 2.0 * series.c[k] * (m_now.cos * h_now.sin);
      out.sine_mean = out.sine_mean + series.c[k] * (m_now.sin * h_now.cos);
      out.cosine_difference = out.cosine_difference - 2.0 * series.c[k] * (m_now.sin * h_now.sin);
      const SinCos<V> m_next = {2.0 * m.cos * m_now.sin - m_before.sin,
                                2.0 * m.cos * m_now.cos - m_before.cos};
      const SinCos<V> h_next = {2.0 * h.cos * h_now.sin - h_before.sin,
                                2.0 * h.cos * h_now.cos - h_before.cos};
      m_before = m_now;
      h_before = h_now;
      m_now = m_next;
      h_now = h_next;
    }
    return out;
  }

  // What a line between two latitudes needs: how much mu grows, how much for one radian of
  // longitude at 45 degrees (d mu / d psi), and the mean sine of the authalic latitude over psi.
  template <Number V>
  struct Course {
    V arc, per_longitude, mean_height;
  };

  // d_lat is the difference, `half` belongs to half of it, `mean` to the middle.
  template <bool Area, Number V>
  TW_INLINE Course<V> course(SinCos<V> lat1, SinCos<V> lat2, SinCos<V> mean, SinCos<V> half,
                             V d_lat) const {
    const V arc = d_lat + sums(to_rectifying, mean, half).sine_difference;
    const auto chi = sums(to_conformal, mean, half);
    const auto chi_mean = turned(mean, chi.sine_mean);
    const auto chi_half = turned(half, 0.5 * chi.sine_difference);
    const V cos1 = turned(lat1, to_conformal.correction(lat1)).cos;
    const V cos2 = turned(lat2, to_conformal.correction(lat2)).cos;
    const V cosines = cos1 * cos2;
    // sinh of psi's growth; infinite at a pole
    const auto inner = cosines > 0.0;
    const V sinh = 2.0 * (chi_mean.cos * chi_half.sin) / select(inner, cosines, 1.0);
    const V psi = asinh(sinh);
    const auto level = sinh == 0.0;
    const V harmless = select(level, 1.0, psi);
    // On a parallel the radius of the parallel over that of the sphere.
    const V parallel = (a / radius) * mean.cos / sqrt(1.0 - e2 * (mean.sin * mean.sin));
    Course<V> out;
    out.arc = arc;
    out.per_longitude = select(inner, select(level, parallel, arc / harmless), 0.0);
    out.mean_height = 0.0;
    if constexpr (Area) {
      const V growth = log1p(2.0 * (chi_mean.sin * chi_half.sin) / select(inner, cos2, 1.0)) +
                       sums(area_terms, chi_mean, chi_half).cosine_difference;
      const V flat = turned(mean, to_authalic.correction(mean)).sin;
      // At a pole the line winds around it without end.
      const V pole = 0.5 * (select(cos1 > 0.0, 0.0, lat1.sin) + select(cos2 > 0.0, 0.0, lat2.sin));
      const V twofold = select((cos1 > 0.0) | (cos2 > 0.0), 2.0 * pole, pole);
      out.mean_height = select(inner, select(level, flat, growth / harmless), twofold);
    }
    return out;
  }

  template <Number V>
  struct Inverse {
    V length;
    SinCos<V> azimuth;  // not of one length
    V area;             // between the line and the equator, positive eastwards in the north
  };

  // Degrees in.  Of two ways around, the shorter; eastwards where both are of one length.
  template <bool Area = false, Number V>
  TW_INLINE Inverse<V> inverse(V lat1, V lon1, V lat2, V lon2) const {
    const V half_angle = 0.5 * (lat2 - lat1);
    const auto line = course<Area>(sincos_degrees(lat1), sincos_degrees(lat2),
                                   sincos_degrees(0.5 * (lat1 + lat2)), sincos_degrees(half_angle),
                                   2.0 * half_angle * kRadiansPerDegree);
    const auto between = degrees_between(lon1, lon2);
    const V lon = (between.value + between.rest) * kRadiansPerDegree;
    const V east = select(lon == -kPi, -lon, lon);
    const V across = east * line.per_longitude;
    return {radius * plain_hypot(across, line.arc),
            {across, line.arc},
            authalic2 * east * line.mean_height};
  }

  template <Number V>
  struct Direct {
    V lat, lon;  // degrees; lon counts from the start and may be many turns
    V area;
    Mask<V> plain;  // the line ends before a pole
  };

  template <bool Area = false, Number V>
  TW_INLINE Direct<V> direct(V lat1, SinCos<V> azimuth, V length) const {
    const auto at = sincos_degrees(lat1);
    const V mu = lat1 * kRadiansPerDegree + to_rectifying.correction(at);
    const V arc = length * azimuth.cos * (1 / radius);
    Direct<V> out;
    out.plain = abs(mu + arc) <= kHalfPi;
    const V safe = select(out.plain, arc, 0.0);
    const auto arc_half = sincos(0.5 * safe);
    const auto mu_at = turned(at, to_rectifying.correction(at));
    const SinCos<V> mu_mean = {mu_at.sin * arc_half.cos + mu_at.cos * arc_half.sin,
                               mu_at.cos * arc_half.cos - mu_at.sin * arc_half.sin};
    const V growth = sums(from_rectifying, mu_mean, arc_half).sine_difference;
    const V d_lat = safe + growth;
    const auto half = turned(arc_half, 0.5 * growth);
    const SinCos<V> mean = {at.sin * half.cos + at.cos * half.sin,
                            at.cos * half.cos - at.sin * half.sin};
    const auto whole = twice(half);
    const SinCos<V> end = {at.sin * whole.cos + at.cos * whole.sin,
                           at.cos * whole.cos - at.sin * whole.sin};
    const auto line = course<Area>(at, end, mean, half, d_lat);
    const V across = length * azimuth.sin * (1 / radius);
    const auto meridian = across == 0.0;
    const auto turns = line.per_longitude > 0.0;
    const V lon = select(meridian, 0.0, across / select(turns, line.per_longitude, 1.0));
    out.plain = out.plain & (turns | meridian);
    out.lat = lat1 + d_lat * kDegreesPerRadian;
    out.lon = lon * kDegreesPerRadian;
    out.area = authalic2 * lon * line.mean_height;
    return out;
  }
};

}  // namespace tidewater::detail
