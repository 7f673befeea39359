/**
 * @file lines.hpp
 * Geodesics and rhumb lines on an ellipsoid: where a line leads, which line joins two points,
 * points along it, length and area of polygons.
 *
 * Angles are degrees: longitudes east, latitudes north, azimuths clockwise from north.  Lengths are
 * in the unit of the semi-major axis, metres by custom.  Objects are values; any number of threads
 * may use one.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Geodesics, to 1,000 km, all azimuths: forward 3.3 nm (1.8 nm), inverse 3.0 nm (1.4 nm);
 * - Geodesics, to 19,000 km, all azimuths: forward 11 nm (4.2 nm), inverse 7.5 nm (3.7 nm);
 * - Geodesics, nearly antipodal, within a degree of the antipode: inverse 7.5 nm (3.7 nm);
 * - Polygon, its perimeter and as scale its relative area, a polygon of 6 million km^2: forward
 *   1.9 nm (1.9 nm), scale 2.2e-16 (2.2e-16);
 * - Rhumb lines, lat -60 to 60, to 2,000 km: forward 2.8 nm (< 1 nm), inverse 1.4 nm (< 1 nm).
 */
#ifndef TIDEWATER_LINES_HPP
#define TIDEWATER_LINES_HPP

#include <cstddef>
#include <memory>

#include "tidewater/coordinates.hpp"
#include "tidewater/ellipsoid.hpp"
#include "tidewater/error.hpp"

namespace tidewater {

/** Where a line ends. */
struct LineEnd {
  double lon;     /**< degrees, within half a turn */
  double lat;     /**< degrees */
  double azimuth; /**< of the line at its end, degrees from -180 to 180 */
  double area;    /**< between the line and the equator, square units of a; positive where the line
                       runs east in the north */
};

/** A line between two points. */
struct LineCourse {
  double length;   /**< in the unit of a */
  double azimuth1; /**< at the first point, degrees from -180 to 180 */
  double azimuth2; /**< at the second, going on */
  double area;     /**< as in LineEnd */
};

/** What a polygon measures. */
struct PolygonMeasure {
  double perimeter; /**< in the unit of a */
  double area; /**< positive for a ring that runs counterclockwise, negative for the other sense; of
                    the two parts of the earth the one of less than half */
};

/** Arrays of lines to lead on: each of `count` numbers. */
struct LineStarts {
  const double* lon;     /**< longitudes, degrees */
  const double* lat;     /**< latitudes, degrees */
  const double* azimuth; /**< degrees clockwise from north */
  const double* length;  /**< in the unit of a; negative for the way behind */
};

/** Where the ends go; null what is not wanted.  May be the arrays of the starts. */
struct LineEnds {
  double* lon = nullptr;     /**< LineEnd::lon */
  double* lat = nullptr;     /**< LineEnd::lat */
  double* azimuth = nullptr; /**< LineEnd::azimuth */
  double* area = nullptr;    /**< LineEnd::area */
};

/** Arrays of pairs of points. */
struct LinePairs {
  const double* lon1; /**< longitudes of the first points, degrees */
  const double* lat1; /**< latitudes of the first points, degrees */
  const double* lon2; /**< longitudes of the second points, degrees */
  const double* lat2; /**< latitudes of the second points, degrees */
};

/** Where the courses go; null what is not wanted. */
struct LineCourses {
  double* length = nullptr;   /**< LineCourse::length */
  double* azimuth1 = nullptr; /**< LineCourse::azimuth1 */
  double* azimuth2 = nullptr; /**< LineCourse::azimuth2 */
  double* area = nullptr;     /**< LineCourse::area */
};

/**
 * Geodesics: the shortest lines.
 *
 * After C. F. F. Karney, Algorithms for geodesics, Journal of Geodesy 87 (2013), 43-55: between any
 * two points, nearly antipodal ones, poles, meridians and the equator included.
 *
 * Latitudes beyond 90 degrees and numbers that are not finite give NaN, counted as failed.
 */
class TW_SYSTEMS_API Geodesic {
 public:
  /**
   * @param a  semi-major axis, above zero
   * @param f  flattening, from -0.01 to 0.01; 0 for a sphere
   * @throws Error for other figures
   */
  Geodesic(double a, double f);
  /** @throws Error for an ellipsoid beyond that flattening */
  explicit Geodesic(const Ellipsoid& ellipsoid);

  double a() const; /**< semi-major axis */
  double f() const; /**< flattening */

  /** Where a line leads: from a point by an azimuth for a length, which may be negative. */
  LineEnd direct(double lon, double lat, double azimuth, double length) const;
  /** The shortest line between two points. */
  LineCourse inverse(double lon1, double lat1, double lon2, double lat2) const;

  /** Where many lines lead, several at a time. */
  Summary direct(std::size_t count, const LineStarts& starts, const LineEnds& ends) const noexcept;
  /** The shortest lines between many pairs of points, several at a time. */
  Summary inverse(std::size_t count, const LinePairs& pairs,
                  const LineCourses& courses) const noexcept;
  /** Points of one line at given lengths from its start. */
  Summary along(double lon, double lat, double azimuth, std::size_t count, const double* lengths,
                const LineEnds& points) const noexcept;

  /**
   * A polygon whose sides are geodesics; the last vertex is joined to the first.
   * Rings may lie around a pole or across any meridian.
   */
  PolygonMeasure polygon(std::size_t count, const double* lon, const double* lat) const;

 private:
  struct Impl;
  std::shared_ptr<const Impl> impl_;
};

/**
 * Rhumb lines: lines of constant azimuth.
 *
 * After C. F. F. Karney, The area of rhumb polygons, Studia Geophysica et Geodaetica 68 (2024),
 * 99-120; parallels and lines close to them keep their digits.
 *
 * Between two points the shorter way around is taken, eastwards where both are of one length.  A
 * point at a pole is reached along its meridian.  A line that would go on over a pole has no end:
 * NaN, counted as failed.
 */
class TW_SYSTEMS_API Rhumb {
 public:
  /** As Geodesic's, for the same figures. */
  Rhumb(double a, double f);
  /** @throws Error for an ellipsoid beyond that flattening */
  explicit Rhumb(const Ellipsoid& ellipsoid);

  double a() const; /**< semi-major axis */
  double f() const; /**< flattening */

  /** Where a line leads: from a point by an azimuth for a length, which may be negative. */
  LineEnd direct(double lon, double lat, double azimuth, double length) const;
  /** The line between two points, the shorter way around. */
  LineCourse inverse(double lon1, double lat1, double lon2, double lat2) const;
  /** Where many lines lead, several at a time. */
  Summary direct(std::size_t count, const LineStarts& starts, const LineEnds& ends) const noexcept;
  /** The lines between many pairs of points, several at a time. */
  Summary inverse(std::size_t count, const LinePairs& pairs,
                  const LineCourses& courses) const noexcept;
  /** Points of one line at given lengths from its start. */
  Summary along(double lon, double lat, double azimuth, std::size_t count, const double* lengths,
                const LineEnds& points) const noexcept;
  /** A polygon whose sides are rhumb lines; otherwise as Geodesic::polygon(). */
  PolygonMeasure polygon(std::size_t count, const double* lon, const double* lat) const;

 private:
  struct Impl;
  std::shared_ptr<const Impl> impl_;
};

}  // namespace tidewater

#endif
