#include "points/operations.hpp"
#include "tidewater/conformal.h"

using namespace tidewater::test;

namespace {

constexpr double kE = 0.0818191910428158;  // GRS 80

const Operations mercator = {
    {"TWmerc_f", geographic(-180, -89), geographic(180, 89),
     [](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
       TWmerc_f(kE, 0.3, 0.1, n, in, out, status);
     }},
    {"TWmerc_f, e = 0.3", geographic(-180, -89), geographic(180, 89),
     [](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
       TWmerc_f(0.3, 0.3, 0.1, n, in, out, status);
     }},
    {"TWmerc_i",
     {-3.2, -4, 0},
     {3.2, 4, 0},
     [](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
       TWmerc_i(kE, 0.3, 0.1, n, in, out, status);
     }},
    {"TWmerc_i, e = 0.3",
     {-3.2, -4, 0},
     {3.2, 4, 0},
     [](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
       TWmerc_i(0.3, 0.3, 0.1, n, in, out, status);
     }},
    {"TWmerc_s", geographic(-180, -89), geographic(180, 89),
     [](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
       TWmerc_s(kE, 0.9996, n, in, out, status);
     }},
};

}  // namespace
