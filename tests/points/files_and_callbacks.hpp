// Array functions that need files or a callback.  They keep a window of the process or walk on from
// point to point, so that they stand apart from operations(), whose points may come in any order.
#pragma once

#include <cmath>
#include <memory>
#include <vector>

#include "points/operations.hpp"
#include "support/data.hpp"
#include "support/grids.hpp"
#include "tidewater/datum.h"
#include "tidewater/special.h"

namespace tidewater::test {

// One grid of each kind: 30 by 30 nodes of a degree, from 110 W and 25 N; smooth shifts of seconds,
// undulations of metres.
struct GridsOfTheContract {
  ScratchFolder folder;
  NadconControl nadcon = {};
  GeoidControl geoid = {};

  GridsOfTheContract() {
    const auto shift = [](int row, int col) {
      return 0.5F + static_cast<float>(row - 2 * col) / 64;
    };
    const GridFile file = {-110, 25, 30, 30, shift};
    for (const char* ending : {".las", ".los", ".geo"}) {
      folder.write("grid" + std::string(ending), file.bytes());
    }
    constexpr double kSeconds = 3600;
    const SubGrid root = {"ROOT",         "NONE",       25 * kSeconds, 54 * kSeconds, 81 * kSeconds,
                          110 * kSeconds, 1 * kSeconds, shift,         shift};
    folder.write("grid.gsb", GsbFile{{root}}.bytes());
    TWstatus status = 0;
    // The first word of a line names a shift grid; from column 15 on stands a geoid grid.
    folder.write("area.par", "grid           grid\n");
    TWnadcon_c(folder.directory().c_str(), &nadcon, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    TWcnt_c(folder.directory().c_str(), 0, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    TWgeo90_c(folder.directory().c_str(), &geoid, &status);
    EXPECT_EQ(status, TW_SUCCESS);
  }

  static const GridsOfTheContract& opened() {
    static const GridsOfTheContract grids;
    return grids;
  }
};

// Lambert's cylindrical equal-area projection of the unit sphere.
inline void equal_area_cylinder(TWcontext, int32_t count, const CoordinateTriple* in,
                                CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  for (int32_t i = 0; i < count; ++i) out[i] = {in[i].x, std::sin(in[i].y), in[i].z};
}

inline std::vector<Operation> files_and_callbacks() {
  const CoordinateTriple low = geographic(-105, 30, -50), high = geographic(-90, 50, 900);
  using Given = const CoordinateTriple*;
  using Taken = CoordinateTriple*;
  return {
      {"TWnadcon_f", low, high,
       [](int32_t n, Given in, Taken out, TWstatus* status) {
         TWnadcon_f(n, in, &GridsOfTheContract::opened().nadcon, out, status);
       }},
      {"TWnadcon_i", low, high,
       [](int32_t n, Given in, Taken out, TWstatus* status) {
         TWnadcon_i(n, in, &GridsOfTheContract::opened().nadcon, out, status);
       }},
      {"TWcnt_f", low, high,
       [](int32_t n, Given in, Taken out, TWstatus* status) {
         GridsOfTheContract::opened();
         TWcnt_f(n, in, 0, out, status);
       }},
      {"TWcnt_i", low, high,
       [](int32_t n, Given in, Taken out, TWstatus* status) {
         GridsOfTheContract::opened();
         TWcnt_i(n, in, 0, out, status);
       }},
      {"TWgeo90_f", low, high,
       [](int32_t n, Given in, Taken out, TWstatus* status) {
         TWgeo90_f(n, in, &GridsOfTheContract::opened().geoid, out, status);
       }},
      {"TWgeo90_i", low, high,
       [](int32_t n, Given in, Taken out, TWstatus* status) {
         TWgeo90_i(n, in, &GridsOfTheContract::opened().geoid, out, status);
       }},
      {"TWgeneric_i",
       {-1, -0.8, 0},
       {1, 0.8, 0},
       [](int32_t n, Given in, Taken out, TWstatus* status) {
         TWgeneric_i(equal_area_cylinder, 0, 0, 0, 0, n, in, out, status);
       }},
      {"the callback of TWgeneric_i", geographic(-60, -50), geographic(60, 50),
       [](int32_t n, Given in, Taken out, TWstatus* status) {
         equal_area_cylinder(0, n, in, out, status);
       }},
  };
}

}  // namespace tidewater::test
