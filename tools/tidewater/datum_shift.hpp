// Datum shifts by formulas of the caller's own.
#pragma once

#include <memory>
#include <optional>
#include <string>

#include "tidewater/ellipsoid.hpp"
#include "tidewater/frame.h"

namespace tidewater::command {

class DatumShift {
 public:
  virtual ~DatumShift() = default;
  // Shifts geodetic points in place, like the library's array calls.
  virtual TWstatus run(int32_t count, CoordinateTriple* points) const = 0;
};

struct ShiftRequest {
  std::string text;  // molodensky:DX,DY,DZ, helmert:DX,DY,DZ,RX,RY,RZ,PPM
  bool inverse = false;
  // Of the points before and after they are shifted, in whichever direction; for a shift by
  // formulas, which needs both.
  std::optional<Ellipsoid> from;
  std::optional<Ellipsoid> to;
};

// Throws std::runtime_error when the shift cannot be made.
std::unique_ptr<DatumShift> make_datum_shift(const ShiftRequest& request);

}  // namespace tidewater::command
