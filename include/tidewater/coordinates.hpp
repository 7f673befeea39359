/**
 * @file coordinates.hpp
 * Arrays of points as the systems layer takes them, and what it answers.
 */
#ifndef TIDEWATER_COORDINATES_HPP
#define TIDEWATER_COORDINATES_HPP

#include <cstddef>
#include <type_traits>

#include "tidewater/error.hpp"
#include "tidewater/frame.h"

namespace tidewater {

/** One point: longitude or easting first, then latitude or northing, then height. */
struct Point {
  double x = 0; /**< longitude, easting or X */
  double y = 0; /**< latitude, northing or Y */
  double z = 0; /**< height or Z */
};

/**
 * A view of an array of points: separate arrays, or interleaved ones with a stride.
 * @tparam T  double or float, const where the points are only read
 */
template <class T>
struct Coordinates {
  T* x;                      /**< longitudes or eastings (X of geocentric systems) */
  T* y;                      /**< latitudes or northings (Y) */
  T* z = nullptr;            /**< heights (Z); null: zero on input, not written on output */
  std::ptrdiff_t stride = 1; /**< from one point to the next, in elements of T */

  /** What may be written may be read. */
  operator Coordinates<const T>() const requires(!std::is_const_v<T>) { return {x, y, z, stride}; }
};

/** Points as x y x y ... (two axes) or x y z x y z ... (three, or more with what follows left
 * alone). */
template <class T>
Coordinates<T> interleaved(T* points, int axes = 2) {
  return {points, points + 1, axes > 2 ? points + 2 : nullptr, axes};
}

/** What an array call found. */
struct Summary {
  std::size_t failed = 0;     /**< points that have no result */
  TWstatus word = TW_SUCCESS; /**< status word of the first of them */

  explicit operator bool() const { return failed == 0; } /**< every point has a result */
};

/** How an array call is run. */
struct Run {
  TWstatus* status = nullptr; /**< a word for each point, or null */
  unsigned threads = 1;       /**< how many at most; 0: as many as the machine has cores */
};

}  // namespace tidewater

#endif
