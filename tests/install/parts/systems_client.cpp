// A client of the systems layer.  Where the library comes without its store the program brings the
// seven operations; these open nothing, and a system that a PROJ string tells whole needs none.
#include <cmath>
#include <cstdio>
#include <tidewater/transformation.hpp>

#ifndef DEFAULT_STORE
#include <tidewater/store.h>

extern "C" {
TWstoreword OLB7R3_PF_open(const char*) { return 0; }
TWstoreword OLB7R3_PF_reset_table(const char*) { return 0; }
TWstoreword OLB7R3_PF_define_table_search(const char*, const char*) { return 0; }
TWstoreword OLB7R3_PF_get_next_row(const char*, void*) { return 0; }
TWstoreword OLB7R3_PF_get_row_by_value(const char*, int32_t, const char*, const void*, void*) {
  return 0;
}
TWstoreword OLB7R3_PF_inq_num_rows(const char*, int32_t*) { return 0; }
TWstoreword OLB7R3_PF_close(int32_t) { return 0; }
}
#endif

int main() {
  try {
    // Snyder 1987, p. 269: UTM of the Clarke ellipsoid of 1866 at 40.5 N, 73.5 W.
    const tidewater::System from("+proj=longlat +a=6378206.4 +b=6356583.8 +no_defs");
    const tidewater::System to("+proj=utm +zone=18 +a=6378206.4 +b=6356583.8 +no_defs");
    const tidewater::Transformation map(from, to);
    const auto at = map.forward({-73.5, 40.5, 0});
    std::printf("%.1f %.1f\n", at.x, at.y);
    if (!(std::fabs(at.x - 627106.5) < 0.1 && std::fabs(at.y - 4484124.4) < 0.1)) return 1;
  } catch (const tidewater::Error& error) {
    std::fprintf(stderr, "%s\n", error.what());
    return 2;
  }
#ifndef DEFAULT_STORE
  try {
    const tidewater::System named("EPSG:2154");
    return 3;
  } catch (const tidewater::Error& error) {
    std::printf("%s\n", error.what());
  }
#endif
  return 0;
}
