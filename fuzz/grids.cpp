// Bytes as a grid file of each form, by the array functions and by the objects.  The first byte
// chooses the form.

#include <array>
#include <cstdint>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <string>

#include "tidewater/datum.h"
#include "tidewater/grids.hpp"

namespace {

namespace fs = std::filesystem;

const std::string& folder() {
  static const std::string path = [] {
    std::string name = (fs::temp_directory_path() / "tidewater-fuzz-XXXXXX").string();
    if (!mkdtemp(name.data())) std::abort();
    return name + "/";
  }();
  return path;
}

void write(const std::string& name, const char* bytes, std::size_t size) {
  std::ofstream(folder() + name, std::ios::binary).write(bytes, static_cast<std::streamsize>(size));
}

// Points all over the Earth, and some twice, so that windows are met again.
std::array<CoordinateTriple, 64> points() {
  std::array<CoordinateTriple, 64> all = {};
  for (std::size_t i = 0; i < all.size(); ++i) {
    const double t = static_cast<double>(i / 2);
    all[i] = {-3.1 + 0.2 * t, -1.5 + 0.097 * t, 10};
  }
  return all;
}

// The array functions: whatever they answer, they write no farther than asked and come back.
void array_functions(int form) {
  const auto in = points();
  auto out = in;
  const auto n = static_cast<int32_t>(in.size());
  TWstatus status = 0;
  if (form == 0) {
    TWcnt_c(folder().c_str(), 0, &status);
    TWcnt_f(n, in.data(), 0, out.data(), &status);
    TWcnt_i(n, in.data(), 0, out.data(), &status);
  } else if (form == 1) {
    NadconControl control = {};
    TWnadcon_c(folder().c_str(), &control, &status);
    TWnadcon_f(n, in.data(), &control, out.data(), &status);
    TWnadcon_i(n, in.data(), &control, out.data(), &status);
  } else {
    GeoidControl control = {};
    TWgeo90_c(folder().c_str(), &control, &status);
    TWgeo90_f(n, in.data(), &control, out.data(), &status);
  }
}

template <class Grid>
void object(const std::string& path) {
  try {
    const Grid grid(path);
    for (const CoordinateTriple& p : points()) {
      double x = p.x * 57, y = p.y * 57, z = p.z;
      grid.inverse(1, {&x, &y, &z}, {&x, &y, &z});
      grid.forward(1, {&x, &y, &z}, {&x, &y, &z});
    }
    grid.describe();
  } catch (const tidewater::Error&) {
  }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  if (size == 0) return 0;
  const int form = data[0] % 5;
  const auto* bytes = reinterpret_cast<const char*>(data + 1);
  const std::size_t length = size - 1;
  switch (form) {
    case 0:
      write("area.par", "g\n", 2);
      write("g.gsb", bytes, length);
      // By contract each opening leaves its file open for good: they are few enough for a while.
      static int openings = 0;
      if (++openings < 500) array_functions(form);
      object<tidewater::ShiftGrid>(folder() + "g.gsb");
      break;
    case 1:
      write("area.par", "g\n", 2);
      write("g.las", bytes, length);
      write("g.los", bytes, length);
      array_functions(form);
      object<tidewater::ShiftGrid>(folder() + "g.las");
      break;
    case 2:
      write("area.par", "0 2 4 6 8 10 12g\n", 17);
      write("g.geo", bytes, length);
      array_functions(form);
      object<tidewater::GeoidGrid>(folder() + "g.geo");
      break;
    case 3:
      write("g.gtx", bytes, length);
      object<tidewater::GeoidGrid>(folder() + "g.gtx");
      break;
    default:
      write("g.tif", bytes, length);
      object<tidewater::ShiftGrid>(folder() + "g.tif");
      object<tidewater::GeoidGrid>(folder() + "g.tif");
  }
  return 0;
}
