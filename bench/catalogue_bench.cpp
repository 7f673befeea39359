// Look-ups in the parameter store that comes with the library.  Each opens it, finds one row or
// lists a table, and closes it, as every call of the catalogue does.
#include "harness.hpp"
#include "tidewater/catalogue.h"

using namespace tidewater::bench;

namespace {

template <class LookUp>
Kernel repeated(LookUp look_up) {
  return [look_up] {
    for (int32_t i = 0; i < kPoints; ++i) keep(look_up());
  };
}

const Suite suite([] {
  add({"Catalogue, system by name",
       "",
       repeated([] {
         int16_t number = 0;
         TWstatus status = 0;
         TWcs_to_num(TIDEWATER_STORE, "Robinson", &number, &status);
         return number;
       }),
       {},
       {}});
  add({"Catalogue, zone by number",
       "",
       repeated([] {
         char name[42];
         TWstatus status = 0;
         TWsp_num_t_nam(TIDEWATER_STORE, 83, 4202, name, &status);
         return name[0];
       }),
       {},
       {}});
  add({"Catalogue, names of 11 datum models",
       "",
       repeated([] {
         char names[16][41];
         TWstatus status = 0;
         TWget_dt_names(TIDEWATER_STORE, -1, names[0], &status);
         return names[0][0];
       }),
       {},
       {}});
});

}  // namespace
