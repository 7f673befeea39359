// The datum shift that --shift names.
#pragma once

#include <memory>
#include <string>

#include "tidewater/frame.h"

namespace tidewater::command {

class DatumShift {
 public:
  virtual ~DatumShift() = default;
  // Shifts geodetic points in place, like the library's array calls.
  virtual TWstatus run(int32_t count, CoordinateTriple* points) = 0;
  // Why a point must not be given to the shift at all; null when it may.
  virtual const char* refusal(const CoordinateTriple&) const { return nullptr; }
};

// From "nadcon:DIR" or "ntv2:DIR".  Throws std::runtime_error when the grids cannot be used.
std::unique_ptr<DatumShift> make_datum_shift(const std::string& text, bool inverse);

}  // namespace tidewater::command
