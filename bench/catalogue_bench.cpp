// Look-ups in the parameter store that comes with the library, one for each point.  Each opens the
// store, finds one row or lists a table, and closes it, as every call of the catalogue does.
#include "harness.hpp"
#include "tidewater/catalogue.h"

using namespace tidewater::bench;

namespace {

template <class LookUp>
void add_look_up(const char* operation, LookUp look_up) {
  Row row;
  row.operation = operation;
  row.ours = side([look_up] {
    for (int32_t i = 0; i < points(); ++i) look_up();
  });
  add(row);
}

const Suite suite([] {
  add_look_up("Catalogue, system by name", [] {
    int16_t number = 0;
    TWstatus status = 0;
    TWcs_to_num(TIDEWATER_STORE, "Robinson", &number, &status);
  });
  add_look_up("Catalogue, zone by number", [] {
    char name[42];
    TWstatus status = 0;
    TWsp_num_t_nam(TIDEWATER_STORE, 83, 4202, name, &status);
  });
  add_look_up("Catalogue, names of 11 datum models", [] {
    char names[16][41];
    TWstatus status = 0;
    TWget_dt_names(TIDEWATER_STORE, -1, names[0], &status);
  });
});

}  // namespace
