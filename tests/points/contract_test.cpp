// What all array functions share, by the adapters of tests/points: nothing to do, the memory around
// and beside the points, in place, the way back, and the peer.  Widths are in widths_test.cpp.

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <cstring>
#include <map>
#include <random>
#include <set>

#include "points/files_and_callbacks.hpp"
#include "points/operations.hpp"
#include "support/proj_peer.hpp"

using namespace tidewater::test;

namespace {

constexpr double kSentinel = -7.25e77;
constexpr CoordinateTriple kNothing = {kSentinel, kSentinel, kSentinel};
constexpr double kPi = 3.14159265358979323846;
constexpr double kDegree = kPi / 180;

using Points = std::vector<CoordinateTriple>;

std::string function_of(const std::string& operation) {
  return operation.substr(0, operation.find(','));
}

const std::vector<Operation>& adapters() {
  static const std::vector<Operation> all = [] {
    std::vector<Operation> both = operations();
    for (Operation& operation : files_and_callbacks()) both.push_back(std::move(operation));
    return both;
  }();
  return all;
}

const Operation& named(const std::string& name) {
  const auto found = std::find_if(adapters().begin(), adapters().end(),
                                  [&](const Operation& o) { return o.name == name; });
  if (found == adapters().end()) throw std::invalid_argument("no adapter " + name);
  return *found;
}

Points strewn(const CoordinateTriple& low, const CoordinateTriple& high, std::size_t count) {
  std::mt19937 random(11);
  const auto between = [&](double a, double b) {
    return a + (b - a) * std::uniform_real_distribution<double>(0, 1)(random);
  };
  Points all(count);
  for (CoordinateTriple& p : all) {
    p = {between(low.x, high.x), between(low.y, high.y), between(low.z, high.z)};
  }
  return all;
}

bool same(const CoordinateTriple& a, const CoordinateTriple& b) {
  return std::memcmp(&a, &b, sizeof a) == 0;
}

std::string test_name(const std::string& text) {
  std::string name;
  for (const char c : text) name += std::isalnum(static_cast<unsigned char>(c)) ? c : '_';
  return name;
}

class Contract : public testing::TestWithParam<Operation> {
 protected:
  const Operation& operation() const { return GetParam(); }
  std::string function() const { return function_of(operation().name); }
};

// The families whose functions stand in these lists say so in their headers.

// The third element of the output is written, a scale or a coordinate.
const std::set<std::string> kWritesThird = {
    "TWmerc_s",     "TWmiller_cyl_s", "TWcyl_eqr_s",   "TWt_merc_s",     "TWt_merc_xyk",
    "TWgaussII_s",  "TWg_schreiber",  "TWlam_s",       "TWalbers_s",     "TWconic_s",
    "TWstereo_s",   "TWaz_eq_s",      "TWlam_az_eq_s", "TWgnomon_s",     "TWortho_s",
    "TWpolycon_s",  "TWcassini_s",    "TWo_merc_uv_k", "TWo_merc_s",     "TWrso_s",
    "TWlabor_s",    "TWlaborde_s",    "TWrobin_s",     "TWsinusoidal_s", "TWbonne_s",
    "TWvdg_s",      "TWbipocc_s",     "TWo_lam_s",     "TWn_zeal_s",     "TWllh_to_xyz",
    "TWxyz_to_llh", "TWlsr_f",        "TWlsr_i",       "TWllh_to_lsr",   "TWlsr_to_llh",
    "TWbw_f",       "TWbw_i",         "TWmol_bdk_f",   "TWmol_bdk_i",    "TWshifts_f",
    "TWshifts_i",   "TWmol_std_f",    "TWmol_std_i",   "TWmre",          "TWgeo90_f",
    "TWgeo90_i"};

// It is the input's: a height that belongs to the point.
const std::set<std::string> kCopiesThird = {"TWpersp_vert_f", "TWpersp_vert_i",
                                            "TWpersp_f",      "TWpersp_i",
                                            "TWchamtri_f",    "TWpoly2deg_f",
                                            "TWpoly2deg_i",   "TWnpoly2d_f",
                                            "TWnpoly2d_i",    "TWnadcon_f",
                                            "TWnadcon_i",     "TWcnt_f",
                                            "TWcnt_i",        "the callback of TWgeneric_i"};

// Another answer in place, by contract: what they read is their output.
const std::set<std::string> kOtherInPlace = {"TWt_merc_xyk",  "TWlabor_s",   "TWgaussII_s",
                                             "TWg_schreiber", "TWcassini_s", "TWpoly2deg_f",
                                             "TWlaborde_s"};

TEST_P(Contract, NothingToDo) {
  for (const int32_t count : {0, -1, -2147483647 - 1}) {
    for (const bool in_place : {false, true}) {
      CoordinateTriple in = kNothing, out = kNothing;
      TWstatus status = 0x5A5A5A5A;
      operation().call(count, in_place ? &out : &in, &out, &status);
      EXPECT_TRUE(same(in, kNothing)) << count;
      // By contract the harmonic sum clears its first point even so.
      if (function() != "TWhar_sum") {
        EXPECT_TRUE(same(out, kNothing)) << count;
      }
      EXPECT_EQ(status, TW_SUCCESS) << std::hex << status;
    }
  }
}

TEST_P(Contract, MemoryBesideThePoints) {
  const std::size_t count = 37;
  const Points in = strewn(operation().low, operation().high, count);
  Points given = in, out(count + 2, kNothing);
  TWstatus status = 0;
  operation().call(static_cast<int32_t>(count), given.data(), out.data() + 1, &status);
  EXPECT_TRUE(same(out.front(), kNothing));
  EXPECT_TRUE(same(out.back(), kNothing));
  std::size_t written = 0;
  for (std::size_t i = 0; i < count; ++i) {
    EXPECT_TRUE(same(given[i], in[i])) << i;
    const CoordinateTriple& p = out[i + 1];
    if (p.x == kSentinel && p.y == kSentinel) continue;  // a point that failed
    ++written;
    if (function() == "TWhar_sum") continue;  // the mode decides
    if (kWritesThird.count(function()) != 0) {
      EXPECT_NE(p.z, kSentinel) << i;
    } else {
      EXPECT_EQ(p.z, kCopiesThird.count(function()) != 0 ? in[i].z : kSentinel) << i;
    }
  }
  // Some point of the ordinary ones is computed, but for the adapters that are there to fail.
  const bool may_fail = operation().name.find("bad ") != std::string::npos ||
                        operation().name.find("out of reach") != std::string::npos ||
                        operation().name.find("wide") != std::string::npos;
  EXPECT_TRUE(written > 0 || may_fail);
}

TEST_P(Contract, InPlaceAsInTwoArrays) {
  if (kOtherInPlace.count(function()) != 0) return;
  const std::size_t count = 41;
  const Points in = strewn(operation().low, operation().high, count);
  // Two arrays, of which the output begins as the input: what is not written is seen as it was.
  Points two = in, one = in;
  TWstatus of_two = 0, of_one = 0;
  operation().call(static_cast<int32_t>(count), in.data(), two.data(), &of_two);
  operation().call(static_cast<int32_t>(count), one.data(), one.data(), &of_one);
  EXPECT_EQ(of_one, of_two);
  for (std::size_t i = 0; i < count; ++i) EXPECT_TRUE(same(one[i], two[i])) << i;
}

INSTANTIATE_TEST_SUITE_P(All, Contract, testing::ValuesIn(adapters()),
                         [](const auto& one) { return test_name(one.param.name); });

// ---- the way back ----

struct Pair {
  const char *forward, *inverse;
  double west, south, east, north;  // degrees, or units of the plane
  double near;
  bool plane = false;
};

class RoundTrip : public testing::TestWithParam<Pair> {};

TEST_P(RoundTrip, ComesBack) {
  const Pair& pair = GetParam();
  const double unit = pair.plane ? 1 : kDegree;
  Points in = strewn({pair.west * unit, pair.south * unit, 0},
                     {pair.east * unit, pair.north * unit, 0}, 200);
  Points there(in.size(), {0, 0, 0}), back(in.size(), kNothing);
  TWstatus status = 0;
  const auto count = static_cast<int32_t>(in.size());
  named(pair.forward).call(count, in.data(), there.data(), &status);
  ASSERT_TRUE(TW_OK(status));
  named(pair.inverse).call(count, there.data(), back.data(), &status);
  EXPECT_TRUE(TW_OK(status));
  for (std::size_t i = 0; i < in.size(); ++i) {
    const double dx = back[i].x - in[i].x;
    EXPECT_NEAR(pair.plane ? dx : std::remainder(dx, 2 * kPi) * std::cos(in[i].y), 0, pair.near)
        << in[i].x << " " << in[i].y;
    EXPECT_NEAR(back[i].y, in[i].y, pair.near) << in[i].x << " " << in[i].y;
  }
}

const Pair kPairs[] = {
    {"TWmerc_f", "TWmerc_i", -160, -88, 190, 88, 1e-14},
    {"TWmerc_f, e = 0.3", "TWmerc_i, e = 0.3", -160, -88, 190, 88, 2e-14},
    {"TWmiller_cyl_f", "TWmiller_cyl_i", -160, -89, 190, 89, 2e-15},
    {"TWcyl_eqr_f", "TWcyl_eqr_i", -160, -89, 190, 89, 2e-15},
    {"TWt_merc_f", "TWt_merc_i", 14, -88, 20, 88, 4e-10},
    {"TWcassini_f", "TWcassini_i", 15, -88, 19, 88, 1e-9},
    {"TWgaussII_f", "TWgaussII_i", -160, -89, 190, 89, 2e-14},
    {"TWgaussII_f, sphere", "TWgaussII_i, sphere", -160, -89, 190, 89, 2e-15},
    {"TWgaussII_f, e = 0.3", "TWgaussII_i, e = 0.3", -160, -89, 190, 89, 2e-14},
    {"TWgauII_f", "TWgauII_i", -3, -3, 3, 3, 2e-15, true},
    {"TWlam_f", "TWlam_i", -270, -60, 75, 89, 2e-14},
    {"TWlam_f, southern", "TWlam_i, southern", -270, -89, 75, 60, 2e-14},
    {"TWlam_f, e = 0.3", "TWlam_i, e = 0.3", -270, -60, 75, 89, 2e-14},
    {"TWalbers_f", "TWalbers_i", -270, -80, 75, 85, 3e-14},
    {"TWconic_f", "TWconic_i", -270, -80, 75, 89, 1e-9},
    {"TWpolycon_f", "TWpolycon_i", -10, -80, 45, 80, 2e-9},
    {"TWbonne_f", "TWbonne_i", -40, -60, 75, 85, 2e-11},
    {"TWbonne_f, sphere", "TWbonne_i, sphere", -40, -60, 75, 85, 2e-11},
    {"TWstereo_f, oblique", "TWstereo_i, oblique", -60, -30, 95, 85, 2e-13},
    {"TWstereo_f, north", "TWstereo_i, north", -160, -30, 195, 89, 2e-13},
    {"TWstereo3_f", "TWstereo3_i", -40, -30, 75, 85, 2e-13},
    {"TWaz_eq_f, oblique", "TWaz_eq_i, oblique", 13, 43, 21, 49, 1e-10},
    {"TWaz_eq_f, sphere", "TWaz_eq_i, sphere", -60, -30, 95, 85, 2e-14},
    {"TWlam_az_eq_f, oblique", "TWlam_az_eq_i, oblique", -60, -30, 95, 85, 2e-13},
    {"TWlam_az_eq_f, equatorial", "TWlam_az_eq_i, equatorial", -60, -60, 95, 60, 2e-13},
    {"TWlam_az_eq_f, north", "TWlam_az_eq_i, north", -160, 1, 195, 89, 2e-13},
    {"TWlam_az_eq_f, south", "TWlam_az_eq_i, south", -160, -89, 195, -1, 2e-13},
    {"TWlam_az_eq_f, oblique, sphere", "TWlam_az_eq_i, oblique, sphere", -60, -30, 95, 85, 2e-14},
    {"TWgnomon_f, oblique", "TWgnomon_i, oblique", -20, 10, 55, 80, 2e-14},
    {"TWgnomon_f, north", "TWgnomon_i, north", -160, 20, 195, 89, 2e-14},
    {"TWortho_f, ellipsoid", "TWortho_i, ellipsoid", -20, 10, 55, 80, 1e-13},
    {"TWortho_f, sphere", "TWortho_i, sphere", -20, 10, 55, 80, 1e-13},
    {"TWpersp_vert_f, ellipsoid", "TWpersp_vert_i, on the surface, ellipsoid", -5, 15, 40, 65,
     1e-12},
    {"TWo_merc_f, ellipsoid", "TWo_merc_i, ellipsoid", 35, -50, 60, 50, 2e-13},
    {"TWo_merc_f, e = 0.3", "TWo_merc_i, e = 0.3", 35, -50, 60, 50, 2e-13},
    {"TWrso_f, ellipsoid", "TWrso_i, ellipsoid", 90, -30, 115, 40, 2e-13},
    {"TWlabor_f", "TWlabor_i, refined", -0.2, -0.2, 0.2, 0.2, 1e-13, true},
    {"TWlaborde_f", "TWlaborde_i", 43, -28, 49, -10, 2e-12},
    {"TWo_lam_f", "TWo_lam_i", 10, 40, 30, 60, 2e-13},
    {"TWbipocc_f", "TWbipocc_i", -105, -15, -50, 60, 2e-9},
    {"TWIMWmodPoly_f, north", "TWIMWmodPoly_i, north", 14, 36, 20, 40, 2e-13},
    {"TWIMWmodPoly_f, south", "TWIMWmodPoly_i, south", 14, -40, 20, -36, 2e-13},
    {"TWn_zeal_f", "TWn_zeal_i", 165, -48, 179, -33, 2e-13},
    {"TWind_phed_f", "TWind_phed_i", 76, 13, 84, 21, 1e-8},
    {"TWrotgrat_f", "TWrotgrat_i", -160, -85, 190, 85, 2e-13},
    {"TWrobin_f", "TWrobin_i", -160, -89, 190, 89, 3e-8},
    {"TWsinusoidal_f", "TWsinusoidal_i", -150, -85, 185, 85, 1e-11},
    {"TWmollweide_f", "TWmollweide_i", -150, -85, 185, 85, 1e-13},
    {"TWeckertIV_f", "TWeckertIV_i", -150, -85, 185, 85, 1e-12},
    {"TWvdg_f", "TWvdg_i", -150, 2, 5, 80, 1e-10},
    {"TWab_to_en", "TWen_to_ab", -3, -3, 3, 3, 1e-15, true},
    {"TWcomplexpol_f", "TWcomplexpol_i", -0.5, -0.5, 0.5, 0.5, 1e-7, true},
    {"TWconform2_f", "TWconform2_i", -0.5, -0.5, 0.5, 0.5, 1e-7, true},
    {"TWnpoly2d_f", "TWnpoly2d_i", -0.5, -0.5, 0.5, 0.5, 1e-12, true},
    {"TWbw_f", "TWbw_i", -7e6, -7e6, 7e6, 7e6, 0.05, true},
    {"TWmol_bdk_f", "TWmol_bdk_i", -7e6, -7e6, 7e6, 7e6, 0.05, true},
    {"TWnadcon_f", "TWnadcon_i", -105, 30, -90, 50, 2e-11},
    {"TWcnt_f", "TWcnt_i", -105, 30, -90, 50, 1e-13},
    {"the callback of TWgeneric_i", "TWgeneric_i", -60, -50, 60, 50, 1e-13},
    {"TWshifts_f", "TWshifts_i", -7e6, -7e6, 7e6, 7e6, 2e-9, true},
};

INSTANTIATE_TEST_SUITE_P(All, RoundTrip, testing::ValuesIn(kPairs),
                         [](const auto& one) { return test_name(one.param.forward); });

#ifdef TIDEWATER_HAVE_PROJ

// ---- the peer ----

struct Peer {
  const char* operation;
  const char* definition;           // in PROJ's words; angles may be radians: 0.3r
  double west, south, east, north;  // degrees
  double near;                      // of the semi-major axis
  double y0 = 0;                    // what the adapter takes off the ordinate
  double size = 1;                  // the peer's unit, in that of the adapter
  bool sphere = false;
};

class AgreesWithProj : public testing::TestWithParam<Peer> {};

TEST_P(AgreesWithProj, Forward) {
  const Peer& peer = GetParam();
  const ProjPeer proj(std::string("+proj=") + peer.definition + " +a=1" +
                      (peer.sphere ? " +b=1" : " +e=0.0818191910428158"));
  ASSERT_TRUE(proj.ok());
  const Points in = strewn({peer.west * kDegree, peer.south * kDegree, 0},
                           {peer.east * kDegree, peer.north * kDegree, 0}, 300);
  Points out(in.size(), kNothing);
  TWstatus status = 0;
  named(peer.operation).call(static_cast<int32_t>(in.size()), in.data(), out.data(), &status);
  EXPECT_TRUE(TW_OK(status));
  for (std::size_t i = 0; i < in.size(); ++i) {
    const CoordinateTriple expected = proj.forward(in[i]);
    EXPECT_NEAR(out[i].x, expected.x * peer.size, peer.near) << in[i].x << " " << in[i].y;
    EXPECT_NEAR(out[i].y, expected.y * peer.size - peer.y0, peer.near) << in[i].x << " " << in[i].y;
  }
}

const Peer kPeers[] = {
    {"TWmerc_f", "merc +lon_0=0.3r", -160, -88, 190, 88, 1e-14, 0.1},
    {"TWmiller_cyl_f", "mill +lon_0=0.3r", -160, -89, 190, 89, 1e-14, 0.1, 1, true},
    {"TWcyl_eqr_f", "eqc +lon_0=0.3r +lat_ts=0.6435011087932844r", -160, -89, 190, 89, 2e-14, 0.1,
     1, true},
    {"TWt_merc_f", "tmerc +lon_0=0.3r +lat_0=0.3r", 15, -84, 20, 84, 4e-10},
    {"TWcassini_f", "cass +lon_0=0.3r +lat_0=0.7r", 15, -84, 20, 84, 4e-10},
    {"TWlam_f", "lcc +lon_0=-1.7r +lat_0=0.4r +lat_1=0.5r +lat_2=0.8r", -270, -60, 75, 89, 2e-13},
    {"TWlam_f, southern", "lcc +lon_0=-1.7r +lat_0=-0.4r +lat_1=-0.5r +lat_2=-0.8r", -270, -89, 75,
     60, 2e-13},
    {"TWalbers_f", "aea +lon_0=-1.7r +lat_0=0.4r +lat_1=0.5r +lat_2=0.8r", -270, -85, 75, 89,
     1e-13},
    {"TWalbers_f, sphere", "aea +lon_0=-1.7r +lat_0=0.4r +lat_1=0.5r +lat_2=0.8r", -270, -85, 75,
     89, 2e-13, 0, 1, true},
    {"TWconic_f", "eqdc +lon_0=-1.7r +lat_0=0.1r +lat_1=0.5r +lat_2=0.8r", -270, -85, 75, 89, 4e-9},
    {"TWpolycon_f", "poly +lon_0=0.3r", -60, -80, 95, 80, 4e-10, 0.1},
    {"TWbonne_f", "bonne +lon_0=0.3r +lat_1=0.7r", -60, -60, 95, 85, 2e-12},
    {"TWbonne_f, sphere", "bonne +lon_0=0.3r +lat_1=0.7r", -60, -60, 95, 85, 2e-12, 0, 1, true},
    {"TWlam_az_eq_f, oblique", "laea +lon_0=0.3r +lat_0=0.8r", -90, -30, 120, 89, 2e-13},
    {"TWlam_az_eq_f, equatorial", "laea +lon_0=0.3r +lat_0=0r", -60, -60, 95, 60, 2e-13},
    {"TWlam_az_eq_f, north", "laea +lon_0=0.3r +lat_0=90", -160, 1, 195, 89, 1e-12},
    {"TWlam_az_eq_f, south", "laea +lon_0=0.3r +lat_0=-90", -160, -89, 195, -1, 1e-12},
    {"TWlam_az_eq_f, oblique, sphere", "laea +lon_0=0.3r +lat_0=0.8r", -90, -30, 120, 89, 2e-13, 0,
     1, true},
    {"TWaz_eq_f, sphere", "aeqd +lon_0=0.3r +lat_0=0.8r", -60, -30, 95, 85, 2e-13, 0, 1, true},
    {"TWaz_eq_f, oblique", "aeqd +lon_0=0.3r +lat_0=0.8r", 14, 43, 20, 49, 4e-7},
    {"TWstereo_f, oblique", "stere +lon_0=0.3r +lat_0=0.8r", -60, -30, 95, 85, 2e-13},
    {"TWstereo_f, equatorial", "stere +lon_0=0.3r +lat_0=0r", -60, -60, 95, 60, 2e-13},
    {"TWstereo_f, north", "stere +lon_0=0.3r +lat_0=90", -160, 0, 195, 89, 2e-13},
    {"TWstereo_f, south", "stere +lon_0=0.3r +lat_0=-90", -160, -89, 195, 0, 2e-13},
    {"TWgnomon_f, oblique", "gnom +lon_0=0.3r +lat_0=0.7r", -20, 5, 55, 80, 1e-12, 0, 1, true},
    {"TWgnomon_f, north", "gnom +lon_0=0.3r +lat_0=90", -160, 20, 195, 89, 1e-12, 0, 1, true},
    {"TWortho_f, ellipsoid", "ortho +lon_0=0.3r +lat_0=0.7r", -20, 5, 55, 80, 2e-14},
    {"TWortho_f, sphere", "ortho +lon_0=0.3r +lat_0=0.7r", -20, 5, 55, 80, 2e-14, 0, 1, true},
    {"TWo_merc_f, ellipsoid", "omerc +lonc=0.81r +lat_0=-0.33r +alpha=0.33r +no_uoff", 35, -50, 60,
     50, 2e-12},
    {"TWsinusoidal_f, sphere", "sinu +lon_0=0.3r", -160, -89, 190, 89, 2e-12, 0.2, 1, true},
    {"TWmollweide_f", "moll +lon_0=0.3r", -160, -85, 190, 85, 1e-7, 0.1, 1, true},
    {"TWeckertIV_f", "eck4 +lon_0=0.3r", -160, -85, 190, 85, 1e-7, 0.1, 1, true},
    {"TWvdg_f", "vandg +lon_0=0.3r", -150, 2, 15, 88, 1e-11, 0.1, 1, true},
};

INSTANTIATE_TEST_SUITE_P(All, AgreesWithProj, testing::ValuesIn(kPeers),
                         [](const auto& one) { return test_name(one.param.operation); });

#endif

}  // namespace
