#include "datum_shift.hpp"

#include <stdexcept>

#include "status_name.hpp"
#include "tidewater/datum.h"

namespace tidewater::command {

namespace {

void require(TWstatus status, const std::string& directory) {
  if (!TW_OK(status)) {
    throw std::runtime_error(directory + ": " + status_meaning(status) + " (" +
                             status_name(status) + ")");
  }
}

class NadconShift : public DatumShift {
 public:
  NadconShift(const std::string& directory, bool inverse) : inverse_(inverse) {
    TWstatus status = TW_SUCCESS;
    TWnadcon_c(directory.c_str(), &control_, &status);
    require(status, directory);
  }

  TWstatus run(int32_t count, CoordinateTriple* points) override {
    TWstatus status = TW_SUCCESS;
    (inverse_ ? TWnadcon_i : TWnadcon_f)(count, points, &control_, points, &status);
    return status;
  }

 private:
  NadconControl control_ = {};
  bool inverse_;
};

class NationalShift : public DatumShift {
 public:
  NationalShift(const std::string& directory, bool inverse) : inverse_(inverse) {
    TWstatus status = TW_SUCCESS;
    TWcnt_c(directory.c_str(), 0, &status);
    require(status, directory);
  }

  TWstatus run(int32_t count, CoordinateTriple* points) override {
    TWstatus status = TW_SUCCESS;
    (inverse_ ? TWcnt_i : TWcnt_f)(count, points, 0, points, &status);
    return status;
  }

  // The grid is searched by the size of the longitude: a point in the east would be given the shift
  // of its mirror image in the west.
  const char* refusal(const CoordinateTriple& point) const override {
    return point.x > 0 ? "east of Greenwich, and national grids serve the western hemisphere"
                       : nullptr;
  }

 private:
  bool inverse_;
};

}  // namespace

std::unique_ptr<DatumShift> make_datum_shift(const std::string& text, bool inverse) {
  const std::size_t colon = text.find(':');
  const std::string kind = text.substr(0, colon);
  if (colon != std::string::npos && colon + 1 < text.size()) {
    std::string directory = text.substr(colon + 1);
    if (directory.back() != '/') directory += '/';
    if (kind == "nadcon") return std::make_unique<NadconShift>(directory, inverse);
    if (kind == "ntv2") return std::make_unique<NationalShift>(directory, inverse);
  }
  throw std::runtime_error("no such shift: " + text + " (nadcon:DIR or ntv2:DIR)");
}

}  // namespace tidewater::command
