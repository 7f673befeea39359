/**
 * @file error.hpp
 * What constructors and named factories of the systems layer throw.
 *
 * Accuracy: no figure; definitions, names and units as the registry has them (docs/accuracy.md).
 */
#ifndef TIDEWATER_ERROR_HPP
#define TIDEWATER_ERROR_HPP

#include <stdexcept>

#if defined(TIDEWATER_STATIC) || defined(TIDEWATER_SYSTEMS_STATIC)
#define TW_SYSTEMS_API
#elif defined(_WIN32)
#if defined(TIDEWATER_SYSTEMS_BUILDING)
#define TW_SYSTEMS_API __declspec(dllexport)
#else
#define TW_SYSTEMS_API __declspec(dllimport)
#endif
#else
#define TW_SYSTEMS_API __attribute__((visibility("default")))
#endif

namespace tidewater {

/** One sentence that names what was asked and what there is. */
class TW_SYSTEMS_API Error : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

}  // namespace tidewater

#endif
