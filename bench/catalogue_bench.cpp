// Look-ups in the parameter store that comes with the library.  Each opens it, finds one row or
// lists a table, and closes it, as every call of the catalogue does.
#include "harness.hpp"
#include "tidewater/catalogue.h"

using namespace tidewater::bench;

namespace {

void look_up(const char* what, std::function<void()> once) {
  add({what, repeated(std::move(once)), {}, {}, {}, "", false});
}

const Suite suite([] {
  look_up("Catalogue, system by name", [] {
    int16_t number = 0;
    TWstatus status = 0;
    TWcs_to_num(TIDEWATER_STORE, "Robinson", &number, &status);
  });
  look_up("Catalogue, zone by number", [] {
    char name[42];
    TWstatus status = 0;
    TWsp_num_t_nam(TIDEWATER_STORE, 83, 4202, name, &status);
  });
  look_up("Catalogue, names of 11 datum models", [] {
    char names[16][41];
    TWstatus status = 0;
    TWget_dt_names(TIDEWATER_STORE, -1, names[0], &status);
  });
});

}  // namespace
