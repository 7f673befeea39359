// Transformations between heights: above the ellipsoid, above geoids, between tide gauges.
#include <gtest/gtest.h>

#include <cmath>
#include <filesystem>
#include <memory>
#include <numbers>
#include <string>

#include "operation.hpp"
#include "registry.hpp"
#include "tidewater/transformation.hpp"

#ifdef TIDEWATER_HAVE_PROJ
#include <proj.h>
#endif

namespace tidewater::test {

namespace {

constexpr const char* kGeoid = "/usr/share/proj/egm96_15.gtx";

bool has(const std::string& text, const char* part) { return text.find(part) != std::string::npos; }

Transformation between(const char* source, const char* target, const char* operation = "") {
  TransformationOptions options;
  options.operation = operation;
  return Transformation{System(source), System(target), options};
}

std::string refusal(const char* source, const char* target, const char* operation = "") {
  try {
    return "not refused: " + between(source, target, operation).describe();
  } catch (const Error& error) {
    return error.what();
  }
}

}  // namespace

#ifdef TIDEWATER_HAVE_PROJ

namespace {

struct Free {
  void operator()(PJ* p) const { proj_destroy(p); }
  void operator()(PJ_CONTEXT* c) const { proj_context_destroy(c); }
};
using Peer = std::unique_ptr<PJ, Free>;
using Context = std::unique_ptr<PJ_CONTEXT, Free>;

// Points around the Earth, in the source's first system, against PROJ both ways, in millimetres and
// in degrees of the same size.
void agree(const char* source, const char* target, double west, double south, double east,
           double north) {
  SCOPED_TRACE(std::string(source) + " to " + target);
  TransformationOptions options;
  options.own_axes = true;
  const Transformation ours{System(source), System(target), options};
  const Context context(proj_context_create());
  const Peer peer(proj_create_crs_to_crs(context.get(), source, target, nullptr));
  ASSERT_TRUE(peer);
  const double near_source = proj_degree_output(peer.get(), PJ_INV) != 0 ? 1e-8 : 1e-3;
  const double near_target = proj_degree_output(peer.get(), PJ_FWD) != 0 ? 1e-8 : 1e-3;
  double worst = 0;
  for (int i = 0; i <= 20; ++i) {
    for (int j = 0; j <= 20; ++j) {
      const double x = west + (east - west) * i / 20;
      const double y = south + (north - south) * j / 20;
      const double z = 100.0 * i - 300;
      const Point there = ours.forward({x, y, z});
      const PJ_COORD expected = proj_trans(peer.get(), PJ_FWD, proj_coord(x, y, z, HUGE_VAL));
      ASSERT_NEAR(there.x, expected.xyz.x, near_target) << x << " " << y;
      ASSERT_NEAR(there.y, expected.xyz.y, near_target) << x << " " << y;
      ASSERT_NEAR(there.z, expected.xyz.z, 1e-3) << x << " " << y;
      worst = std::max(worst, std::fabs(there.z - expected.xyz.z));
      const Point back = ours.inverse(there);
      ASSERT_NEAR(back.x, x, near_source);
      ASSERT_NEAR(back.y, y, near_source);
      // Similarities there and back leave the squares of their rotations.
      ASSERT_NEAR(back.z, z, 1e-4);
    }
  }
  std::printf("%s to %s: heights within %.2g m\n", source, target, worst);
}

}  // namespace

TEST(Heights, ByGeoidAgreeWithThePeer) {
  if (!std::filesystem::exists(kGeoid)) GTEST_SKIP() << "PROJ's " << kGeoid << " is not installed";
  agree("EPSG:4979", "EPSG:4326+5773", -89.9, -180, 89.9, 180);
  agree("EPSG:4326+5773", "EPSG:4979", -89.9, -180, 89.9, 180);
  agree("EPSG:32631+5773", "EPSG:4979", 200000, -5e6, 800000, 9e6);
  agree("EPSG:32631+5773", "EPSG:4978", 200000, 1000, 800000, 9e6);
  // Another datum on the way, whose heights are above its own ellipsoid.
  agree("EPSG:4985", "EPSG:4326+5773", -80, -179, 80, 179);
}

TEST(Heights, ByOffsetsAgreeWithThePeer) {
  agree("EPSG:4167+4440", "EPSG:4167+5767", -38, 173.5, -35, 175);
  agree("EPSG:4167+5767", "EPSG:4167+4440", -38, 173.5, -35, 175);
  // With a slope
  agree("EPSG:4258+5728", "EPSG:4258+5730", 46, 6, 47.5, 10);
}

#endif

// Guidance note 7-2 of the registry, example of method 1046: LN02 height 473 m at 47 20 N, 9 40 E
// is EVRF2000 height 472.69 m; PROJ, to which ByOffsetsAgreeWithThePeer holds the same operation,
// has it too.
TEST(Heights, OffsetAndSlopeOfTheGuidanceNote) {
  const Transformation map = between("EPSG:4258+5728", "EPSG:4258+5730");
  const Point there = map.forward({9 + 40.0 / 60, 47 + 20.0 / 60, 473});
  EXPECT_DOUBLE_EQ(there.x, 9 + 40.0 / 60);
  EXPECT_NEAR(there.z, 472.69, 0.005);
  EXPECT_EQ(map.inverse(there).z, 473);
}

// The methods by geoid are those that the registry names so, whatever the form of their grids.
TEST(Heights, MethodsByGeoidAreTheRegistrys) {
  int count = 0;
  for (int code = 1000; code < 10000; ++code) {
    const std::string name = detail::Registry::shared().method_name(code);
    bool by_geoid = false;
    for (const char* words : {"Geographic3D to GravityRelatedHeight", "Geographic3D to Depth",
                              "Geog3D to Geog2D+GravityRelatedHeight", "Geog3D to Geog2D+Depth"}) {
      by_geoid |= has(name, words);
    }
    EXPECT_EQ(detail::is_geoid_grid(code), by_geoid) << code << " " << name;
    count += by_geoid ? 1 : 0;
  }
  EXPECT_GT(count, 20);
}

// The Caspian Sea stands 28 m below the Baltic: what lies 30 m below the one lies 2 m below the
// other, also where the heights of either count upwards.
TEST(Heights, OffsetsBetweenDepths) {
  const Transformation depths = between("EPSG:4284+5612", "EPSG:4284+5706");
  EXPECT_EQ(depths.operation(), "EPSG:5440");
  EXPECT_NEAR(depths.forward({50, 40, 30}).z, 2, 1e-12);
  EXPECT_NEAR(depths.inverse({50, 40, 2}).z, 30, 1e-12);
  EXPECT_NEAR(between("EPSG:4284+5705", "EPSG:4284+5706").forward({50, 40, -30}).z, 2, 1e-12);
  EXPECT_NEAR(between("EPSG:4284+5611", "EPSG:4284+5705").forward({50, 40, -2}).z, -30, 1e-12);
}

TEST(Heights, ByGridOfTheCallers) {
  if (!std::filesystem::exists(kGeoid)) GTEST_SKIP() << "PROJ's " << kGeoid << " is not installed";
  const Point at = {8, 46, 100};
  const Point chosen = between("EPSG:4979", "EPSG:4326+5773").forward(at);
  const Point named = between("EPSG:4979", "EPSG:4326+5773", "EPSG:10084").forward(at);
  EXPECT_EQ(chosen.z, named.z);
  const Transformation own = between("EPSG:4937", "EPSG:2154+5720", "geoid:egm96_15.gtx");
  EXPECT_NEAR(own.forward(at).z, chosen.z, 1e-6);
  EXPECT_TRUE(has(own.describe(), "egm96_15.gtx"));
  EXPECT_TRUE(std::isnan(own.accuracy()));
  EXPECT_TRUE(has(refusal("EPSG:4979", "EPSG:4326+5773", "geoid:none.gtx"), "none.gtx"));
  EXPECT_TRUE(has(refusal("EPSG:4979", "EPSG:4326+5773", "EPSG:4441"), "that was named"));
}

// Heights that stand above the same surface stay, whatever their unit and sense; positions change
// datum without them.
TEST(Heights, UnitsAndDepthsOfOneSurface) {
  const Point feet = between("EPSG:4269+5703", "EPSG:4269+6360").forward({-100, 40, 120});
  EXPECT_NEAR(feet.z, 120 * 39.37 / 12, 1e-9);  // US survey feet
  const Point depth = between("EPSG:4269+5703", "EPSG:4269+6357").forward({-100, 40, 120});
  EXPECT_NEAR(depth.z, -120, 1e-12);
  const Point below = between("EPSG:4269+6357", "EPSG:4269+5703").forward({-100, 40, 120});
  EXPECT_NEAR(below.z, -120, 1e-12);
  const Transformation map = between("EPSG:27572+5720", "EPSG:2154+5720");
  EXPECT_EQ(map.forward({600000, 2200000, 77}).z, 77);
  EXPECT_EQ(map.inverse(map.forward({600000, 2200000, 77})).z, 77);
}

// A made-up vertical datum of WGS 84's compound system, in WKT.
std::string own_heights(const std::string& name, const std::string& rest = "UNIT[\"metre\",1]") {
  return "COMPD_CS[\"mine\",GEOGCS[\"WGS 84\",DATUM[\"WGS_1984\",SPHEROID[\"WGS 84\",6378137,"
         "298.257223563]],PRIMEM[\"Greenwich\",0],UNIT[\"degree\",0.0174532925199433],"
         "AUTHORITY[\"EPSG\",\"4326\"]],VERT_CS[\"" +
         name + "\",VERT_DATUM[\"own\",2005]," + rest + "]]";
}

// Heights that no registry knows are those of their own name alone, and nothing but a grid leads
// there, not even from heights above the ellipsoid, which have no name either.
TEST(Heights, OfADefinitionsOwnSurface) {
  const std::string metres = own_heights("harbour");
  const std::string feet = own_heights("harbour", "UNIT[\"foot\",0.3048]");
  EXPECT_NEAR(between(metres.c_str(), feet.c_str()).forward({8, 46, 30.48}).z, 100, 1e-12);
  EXPECT_TRUE(has(refusal(metres.c_str(), own_heights("quay").c_str()), "and harbour"));
  EXPECT_TRUE(has(refusal("EPSG:4979", metres.c_str()),
                  "No way is known between heights above the ellipsoid and harbour; name a grid"));
  EXPECT_TRUE(has(refusal("EPSG:4979", own_heights("").c_str()), "those of mine; name a grid"));
  EXPECT_TRUE(has(refusal(own_heights("").c_str(), "EPSG:4978"), "those of mine; name a grid"));
  EXPECT_TRUE(has(refusal("EPSG:4979", metres.c_str(), "EPSG:10084"),
                  "and harbour by the operation that was named"));
  // A code that this registry lacks is the same as itself, and as nothing else.
  const auto coded = [](const char* name, const char* code) {
    return own_heights(name, "UNIT[\"metre\",1],AUTHORITY[\"EPSG\",\"" + std::string(code) + "\"]");
  };
  EXPECT_EQ(between(coded("a", "99991").c_str(), coded("a", "99991").c_str()).forward({8, 46, 5}).z,
            5);
  EXPECT_TRUE(has(refusal(coded("a", "99991").c_str(), coded("a", "99992").c_str()), "No way"));
  EXPECT_TRUE(has(refusal(coded("a", "99991").c_str(), "EPSG:4326+5773"), "No way"));
  EXPECT_TRUE(has(refusal(coded("a", "99991").c_str(), "EPSG:4326+5773"), "No way"));
  EXPECT_TRUE(has(refusal("EPSG:4326+5773", coded("a", "99991").c_str()), "No way"));
  // By a name of its own a code is still that of the registry.
  EXPECT_EQ(between(coded("a", "5773").c_str(), "EPSG:4326+5773").forward({8, 46, 5}).z, 5);
}

// Operations on heights and on positions may be named together, in any order; each is used or told.
TEST(Heights, NamedTogetherWithPositions) {
  if (!std::filesystem::exists(kGeoid)) GTEST_SKIP() << "PROJ's " << kGeoid << " is not installed";
  // OSGB36 to WGS 84 by the older of the registry's similarities, then heights above EGM96.
  const Transformation both =
      between("EPSG:4277+5701", "EPSG:4979", "geoid:egm96_15.gtx EPSG:1314");
  const Transformation other_order =
      between("EPSG:4277+5701", "EPSG:4979", "EPSG:1314 geoid:egm96_15.gtx");
  const Transformation positions = between("EPSG:4277", "EPSG:4326", "EPSG:1314");
  const Point at = {-2, 53, 100};
  const Point there = both.forward(at);
  EXPECT_EQ(other_order.forward(at).z, there.z);
  EXPECT_EQ(other_order.forward(at).x, there.x);
  const Point flat = positions.forward(at);
  // Heights above Airy's ellipsoid move some tens of metres, which is worth millimetres on the way.
  EXPECT_NEAR(there.x, flat.x, 2e-7);
  EXPECT_NEAR(there.y, flat.y, 2e-7);
  EXPECT_EQ(both.operation(), "geoid:egm96_15.gtx EPSG:1314");
  EXPECT_EQ(between("EPSG:4277+5701", "EPSG:4979", both.operation().c_str()).forward(at).z,
            there.z);
  // Two steps of positions.
  const Transformation chain =
      between("EPSG:4277+5701", "EPSG:4937", "geoid:egm96_15.gtx EPSG:1314 EPSG:1149");
  EXPECT_TRUE(has(chain.describe(), "EPSG:1314") && has(chain.describe(), "EPSG:1149"));
  EXPECT_NEAR(chain.forward(at).x, there.x, 1e-9);
  // A sign is taken, as the heights of the two systems give the direction.
  EXPECT_EQ(between("EPSG:4979", "EPSG:4326+5773", "-EPSG:10084").forward({8, 46, 0}).z,
            between("EPSG:4979", "EPSG:4326+5773", "EPSG:10084").forward({8, 46, 0}).z);
  // What finds nothing to do is told.
  for (const char* rest : {"EPSG:1671", "EPSG:1671 EPSG:1149", "EPSG:99999999", "nonsense"}) {
    const std::string why =
        refusal("EPSG:4979", "EPSG:4326+5773", ("EPSG:10084 " + std::string(rest)).c_str());
    EXPECT_TRUE(has(why, ("There is no change of datum for \"" + std::string(rest) +
                          "\" between WGS 84 and WGS 84 + EGM96 height.")
                             .c_str()))
        << why;
  }
  // A named grid that is not there is told alone, without the others.
  const std::string why = refusal("EPSG:4979", "EPSG:2154+5720", "EPSG:8885");
  EXPECT_TRUE(has(why, "needs the grid RAF18.mnt (or fr_ign_RAF18.tif); name a grid")) << why;
  EXPECT_FALSE(has(why, "RAF20")) << why;
}

TEST(Heights, RefusalsNameWhatIsMissing) {
  EXPECT_TRUE(has(refusal("EPSG:4979", "EPSG:2154+5720"), "needs the grid RAF20.tac"));
  EXPECT_TRUE(has(refusal("EPSG:5720", "EPSG:4979"), "A height alone is not a position"));
  EXPECT_TRUE(has(refusal("EPSG:4979", "EPSG:5720"), "A height alone is not a position"));
  // Between two vertical datums by a method that is not computed here, and by an operation that is
  // of other ones.
  EXPECT_TRUE(has(refusal("EPSG:4267+7968", "EPSG:4267+5703"), "and NGVD29 height (m); name"));
  EXPECT_TRUE(has(refusal("EPSG:4258+5728", "EPSG:4258+5730", "EPSG:4441"),
                  "and LN02 height by the operation that was named; name"));
  EXPECT_TRUE(has(between("EPSG:4979", "EPSG:4326+5720", "no shift").describe(), "nothing"));
}

}  // namespace tidewater::test
