// Every system of the registry as PROJ writes it, read here; and as it is written here, read back
// and read by PROJ.
#include <gtest/gtest.h>

#include <cmath>
#include <functional>
#include <map>
#include <span>
#include <string>
#include <utility>
#include <vector>

#include "makers.hpp"
#include "methods.hpp"
#include "registry.hpp"
#include "system_impl.hpp"
#include "text_forms.hpp"
#include "tidewater/transformation.hpp"

#ifdef TIDEWATER_HAVE_PROJ
#include <proj.h>
#endif

using namespace tidewater;
using namespace tidewater::detail;

namespace {

constexpr double kDegree = kPi / 180;

bool near(double a, double b, double tolerance) {
  return std::fabs(a - b) <= tolerance * std::max(1.0, std::fabs(b));
}

// What differs, in words; empty where the figures are the same.  Angles to 1e-12 radians, which is
// what 15 digits of degrees hold; the datum's registry code where it is asked for.
std::string difference(const Definition& read, const Definition& known, bool same_datum) {
  if (read.kind != known.kind) return "kind";
  if (known.kind == SystemKind::vertical) {
    return near(read.vertical_unit.factor, known.vertical_unit.factor, 1e-12) ? "" : "unit";
  }
  if (!near(read.datum.ellipsoid.a, known.datum.ellipsoid.a, 1e-12)) return "semi-major axis";
  // The flattening, since texts name 1/f with eight to fifteen digits.
  const auto flattening = [](const Definition& definition) {
    const double rf = definition.datum.ellipsoid.inverse_flattening;
    return rf == 0 ? 0 : 1 / rf;
  };
  if (!near(flattening(read), flattening(known), 1e-13)) return "flattening";
  if (!near(read.datum.meridian.longitude, known.datum.meridian.longitude, 1e-11)) {
    return "meridian";
  }
  if (!near(read.unit.factor, known.unit.factor, 1e-12)) return "unit";
  if (same_datum && read.datum.code != known.datum.code) {
    return "datum " + read.datum.name + " for " + known.datum.name;
  }
  if (read.method != known.method) return "method " + std::to_string(read.method);
  if (known.method == 0) return "";
  const Method* method = method_by_code(known.method);
  if (method == nullptr) return "no method";
  for (const MethodParameter& parameter : method->parameters) {
    const ParameterKind& kind = *parameter_kind(parameter.code);
    double value = read.parameter(parameter.code, kind.usual);
    const double expected = known.parameter(parameter.code, kind.usual);
    // Azimuths may be a whole turn apart.
    if (parameter.code == kAzimuth) value += 2 * kPi * std::round((expected - value) / (2 * kPi));
    if (!near(value, expected, 1e-12)) return std::string(kind.name);
  }
  return "";
}

// A PROJ string has neither heights nor units of angle.
Definition without_heights(Definition definition) {
  if (definition.kind == SystemKind::geographic3d || definition.kind == SystemKind::compound) {
    definition.kind = definition.method != 0 ? SystemKind::projected : SystemKind::geographic2d;
  }
  if (definition.kind == SystemKind::geographic2d) {
    definition.unit = {"degree", 9102, kDegree};
  }
  return definition;
}

// A difference that the text itself forces, with its reason.
struct Expected {
  std::string_view form;  // the beginning of its name
  int method;
  std::string_view what;  // the beginning of the difference, or of the sentence that refuses
};

// What differs or is refused, counted by method and kind of difference.
struct Exceptions {
  std::map<std::string, int> counts;
  std::map<std::string, std::string> examples;
  int systems = 0;
  int total = 0;

  void note(const Definition& known, const std::string& what) {
    ++total;
    const std::string key = std::to_string(known.method) + ": " + what;
    if (counts[key]++ == 0) examples[key] = std::to_string(known.code) + " " + known.name;
  }
  // Only those remain that nothing forces.
  std::string unexpected(std::string_view form, std::span<const Expected> expected) const {
    std::string text;
    for (const auto& [key, count] : counts) {
      bool known = false;
      for (const Expected& one : expected) {
        const std::string begin = std::to_string(one.method) + ": " + std::string(one.what);
        known = known || (form.starts_with(one.form) && key.starts_with(begin));
      }
      if (!known) text += std::to_string(count) + " x " + key + " (" + examples.at(key) + ")\n";
    }
    return text;
  }
};

const std::vector<Definition>& known_systems() {
  static const std::vector<Definition> all = [] {
    std::vector<Definition> definitions;
    for (const int code : Registry::shared().systems()) {
      definitions.push_back(definition_from_registry(code));
    }
    return definitions;
  }();
  return all;
}

// What version 1 and PROJ strings cannot say.
constexpr Expected kWrittenDifferently[] = {
    {"WKT 1", 1111, "method 9807"},  // has no three axes
    {"WKT of", 1111, "method 9807"},
    {"WKT of", 9804, "method 9805"},  // the dialect knows the parallel of true scale
    {"PROJ", 1111, "method 9807"},
    {"PROJ", 0, "PROJ strings have no form for"},  // vertical systems
    {"PROJ", 1027, "PROJ strings have no form for"},
    {"PROJ", 1028, "PROJ strings have no form for"},
    {"PROJ", 9803, "PROJ strings have no form for"},
    {"PROJ", 9816, "PROJ strings have no form for"},
    {"PROJ", 9817, "PROJ strings have no form for"},
    {"PROJ", 9824, "PROJ strings have no form for"},
    {"PROJ", 9830, "PROJ strings have no form for"},
    {"PROJ", 9832, "PROJ strings have no form for"},
};

TEST(TextFormsRegistry, WhatIsWrittenIsReadBack) {
  struct Form {
    const char* name;
    std::function<Definition(const Definition&)> there_and_back;
    bool same_datum;
  };
  const auto by_wkt = [](Wkt version) {
    return [version](const Definition& d) {
      return definition_from_wkt(wkt_from_definition(d, version));
    };
  };
  const Form forms[] = {
      {"WKT 2", by_wkt(Wkt::wkt2), true},
      {"WKT 1", by_wkt(Wkt::wkt1), true},
      {"WKT of .prj files", by_wkt(Wkt::esri), false},
      {"PROJ", [](const Definition& d) { return definition_from_proj(proj_from_definition(d)); },
       false},
  };
  for (const Form& form : forms) {
    Exceptions exceptions;
    for (const Definition& known : known_systems()) {
      ++exceptions.systems;
      try {
        const bool proj = form.name == std::string_view("PROJ");
        const std::string what = difference(form.there_and_back(known),
                                            proj ? without_heights(known) : known, form.same_datum);
        if (!what.empty()) exceptions.note(known, what);
      } catch (const Error& error) {
        exceptions.note(known, error.what());
      }
    }
    EXPECT_EQ(exceptions.unexpected(form.name, kWrittenDifferently), "") << form.name;
    EXPECT_GT(exceptions.systems, 6000) << form.name;
  }
}

#ifdef TIDEWATER_HAVE_PROJ

// Where PROJ's text is of another method than the registry's, or less exact.
constexpr Expected kReadDifferently[] = {
    {"WKT 1", 1027, "method 9820"},  // PROJ has one name for both
    {"WKT of", 1027, "method 9820"},   {"PROJ", 1027, "method 9820"},
    {"WKT 1", 9832, "method -9"},      {"WKT of", 9832, "method -9"},
    {"PROJ", 9832, "method -9"},       {"WKT of", 1111, "kind"},  // written with heights of its own
    {"WKT of", 9804, "method 9805"},  // written with the parallel of true scale
    {"WKT of", 9812, "Angle from"},   // 5247: its angle to fewer digits
    {"PROJ", 1028, "method 1029"},    // PROJ's formula is the sphere's
    {"PROJ", 1111, "method 9807"},    // has no three axes
    {"PROJ", 9803, "method 9802"},    // PROJ leaves the cone's angle out
    {"PROJ", 9815, "method 9814"},    // the Swiss grids, whose azimuth is 90 degrees
    {"PROJ", 0, "semi-major axis"},   // PROJ's bess_nam is 0.28 mm short
    {"PROJ", 9807, "semi-major axis"}, {"PROJ", 9808, "semi-major axis"},
};

TEST(TextFormsRegistry, WhatProjWritesIsRead) {
  PJ_CONTEXT* context = proj_context_create();
  proj_log_level(context, PJ_LOG_NONE);
  struct Form {
    const char* name;
    std::function<const char*(PJ*)> write;
    bool wkt;
    bool same_datum;
  };
  const auto wkt = [context](PJ_WKT_TYPE type) {
    return [context, type](PJ* crs) {
      const char* const options[] = {"MULTILINE=NO", nullptr};
      return proj_as_wkt(context, crs, type, options);
    };
  };
  const Form forms[] = {
      {"WKT 2:2019", wkt(PJ_WKT2_2019), true, true},
      {"WKT 2:2015", wkt(PJ_WKT2_2015), true, true},
      {"WKT 1", wkt(PJ_WKT1_GDAL), true, true},
      {"WKT of .prj files", wkt(PJ_WKT1_ESRI), true, false},
      {"PROJ", [context](PJ* crs) { return proj_as_proj_string(context, crs, PJ_PROJ_4, nullptr); },
       false, false},
  };
  std::vector<Exceptions> exceptions(std::size(forms));
  for (const Definition& known : known_systems()) {
    PJ* crs = proj_create_from_database(context, "EPSG", std::to_string(known.code).c_str(),
                                        PJ_CATEGORY_CRS, 0, nullptr);
    if (crs == nullptr) continue;
    for (std::size_t i = 0; i < std::size(forms); ++i) {
      const char* text = forms[i].write(crs);
      if (text == nullptr) continue;  // PROJ has none
      // Of a vertical system PROJ writes its unit alone.
      if (!forms[i].wkt && known.kind == SystemKind::vertical) continue;
      ++exceptions[i].systems;
      try {
        const Definition read =
            forms[i].wkt ? definition_from_wkt(text) : definition_from_proj(text);
        const std::string what =
            difference(read, forms[i].wkt ? known : without_heights(known), forms[i].same_datum);
        if (!what.empty()) exceptions[i].note(known, what);
      } catch (const Error& error) {
        exceptions[i].note(known, error.what());
      }
    }
    proj_destroy(crs);
  }
  for (std::size_t i = 0; i < std::size(forms); ++i) {
    EXPECT_EQ(exceptions[i].unexpected(forms[i].name, kReadDifferently), "") << forms[i].name;
    EXPECT_GT(exceptions[i].systems, 6000) << forms[i].name;
  }
  proj_context_destroy(context);
}

// The plane of a projected system as PROJ computes it from a text; empty where it cannot.
class PeerPlane {
 public:
  PeerPlane(PJ_CONTEXT* context, PJ* crs) {
    if (crs == nullptr) return;
    PJ* base = proj_crs_get_geodetic_crs(context, crs);
    PJ* way = base != nullptr ? proj_create_crs_to_crs_from_pj(context, base, crs, nullptr, nullptr)
                              : nullptr;
    if (PJ* axes = base != nullptr ? proj_crs_get_coordinate_system(context, base) : nullptr) {
      proj_cs_get_axis_info(context, axes, 0, nullptr, nullptr, nullptr, &unit_, nullptr, nullptr,
                            nullptr);
      proj_destroy(axes);
    }
    if (way != nullptr) {
      // Longitude and easting first, whatever the systems' axes.
      way_ = proj_normalize_for_visualization(context, way);
      proj_destroy(way);
    }
    proj_destroy(base);
    proj_destroy(crs);
  }
  ~PeerPlane() { proj_destroy(way_); }
  PeerPlane(const PeerPlane&) = delete;
  PeerPlane& operator=(const PeerPlane&) = delete;

  explicit operator bool() const { return way_ != nullptr; }
  // Of radians; PROJ wants the unit of the base system.
  PJ_COORD operator()(double longitude, double latitude) const {
    return proj_trans(way_, PJ_FWD, proj_coord(longitude / unit_, latitude / unit_, 0, 0));
  }

 private:
  double unit_ = kDegree;
  PJ* way_ = nullptr;
};

// The same plane, metre for metre, from our text as from PROJ's own record of the system.
TEST(TextFormsRegistry, WhatIsWrittenIsTheSamePlaneToProj) {
  PJ_CONTEXT* context = proj_context_create();
  proj_log_level(context, PJ_LOG_NONE);
  std::map<int, int> taken;  // systems of each method
  std::map<std::string, int> compared;
  std::string differences;
  for (const Definition& known : known_systems()) {
    if (known.kind != SystemKind::projected) continue;
    // Every tenth of the methods that have thousands.
    const int nth = taken[known.method]++;
    if (nth > 20 && nth % 40 != 0) continue;
    const PeerPlane peer(
        context, proj_create_from_database(context, "EPSG", std::to_string(known.code).c_str(),
                                           PJ_CATEGORY_CRS, 0, nullptr));
    if (!peer) continue;
    const double pm = known.datum.meridian.longitude / kDegree;
    double west = known.west, east = known.east;
    if (west > east) east += 360;
    const std::pair<const char*, std::function<std::string()>> texts[] = {
        {"WKT 2", [&] { return wkt_from_definition(known, Wkt::wkt2); }},
        {"WKT 1", [&] { return wkt_from_definition(known, Wkt::wkt1); }},
        {"WKT of .prj files", [&] { return wkt_from_definition(known, Wkt::esri); }},
        {"PROJ", [&] { return proj_from_definition(known); }},
    };
    for (const auto& [form, write] : texts) {
      std::string text;
      try {
        text = write();
      } catch (const Error&) {
        continue;  // told by the test above
      }
      // PROJ has it since 9.4.
      if (text.find("+proj=mod_krovak") != std::string::npos) continue;
      const PeerPlane ours(context, proj_create(context, text.c_str()));
      const std::string name =
          std::to_string(known.method) + " " + form + ", " + std::to_string(known.code) + " ";
      if (!ours) {
        differences += name + known.name + ": not read\n";
        continue;
      }
      ++compared[form];
      double worst = 0;
      for (int i = 1; i <= 3; ++i) {
        const double longitude = west + (east - west) * i / 4 - pm;
        const double latitude = known.south + (known.north - known.south) * i / 4;
        const PJ_COORD a = peer(longitude * kDegree, latitude * kDegree);
        const PJ_COORD b = ours(longitude * kDegree, latitude * kDegree);
        if (!std::isfinite(a.xy.x)) continue;
        const double dx = std::fabs(a.xy.x - b.xy.x), dy = std::fabs(a.xy.y - b.xy.y);
        worst = std::max(worst, std::max(dx, dy) * known.unit.factor);
      }
      if (!(worst < 1e-3)) {
        differences += name + known.name + ": " + std::to_string(worst) + " m\n";
      }
    }
  }
  EXPECT_EQ(differences, "");
  for (const auto& [form, count] : compared) EXPECT_GT(count, 350) << form;
  proj_context_destroy(context);
}

// Axes to the west and south, with a false origin: the same figures as PROJ's, from the string as
// it stands and as it is written again.
TEST(TextFormsRegistry, TurnedAxesAreThoseOfProj) {
  PJ_CONTEXT* context = proj_context_create();
  const std::string kTurned[] = {
      "+proj=tmerc +lon_0=29 +axis=wsu +x_0=100 +y_0=50 +ellps=WGS84",
      "+proj=tmerc +lon_0=29 +axis=swu +x_0=100 +y_0=50 +ellps=WGS84",
      "+proj=tmerc +lon_0=29 +axis=wnu +x_0=100 +y_0=50 +ellps=WGS84",
      "+proj=tmerc +lon_0=29 +axis=esu +x_0=100 +y_0=50 +ellps=WGS84",
      "+proj=bonne +lat_1=40 +axis=wsu +x_0=100 +y_0=50 +ellps=WGS84",
      "+proj=lcc +lat_1=40 +axis=wnu +x_0=100 +y_0=50 +ellps=WGS84",
      "+proj=lcc +lat_1=40 +axis=nwu +x_0=100 +y_0=50 +ellps=WGS84",
      "+proj=lcc +lat_1=40 +lat_2=50 +axis=wnu +x_0=100 +y_0=50 +ellps=WGS84",
      "+proj=krovak +axis=swu +x_0=100 +y_0=50 +ellps=bessel",
      "+proj=krovak +axis=wsu +x_0=100 +y_0=50 +ellps=bessel",
      "+proj=krovak +axis=enu +x_0=100 +y_0=50 +ellps=bessel",
      "+proj=cass +lat_0=48 +lon_0=14 +axis=swu +x_0=100 +y_0=50 +ellps=WGS84",
      "+proj=laea +lat_0=40 +axis=neu +x_0=100 +y_0=50 +ellps=WGS84",
  };
  TransformationOptions options;
  options.own_axes = true;
  options.operation = "no shift";
  for (const std::string& text : kTurned) {
    PJ* peer = proj_create(context, text.c_str());
    ASSERT_NE(peer, nullptr) << text;
    const PJ_COORD theirs = proj_trans(peer, PJ_FWD, proj_coord(20 * kDegree, 45 * kDegree, 0, 0));
    proj_destroy(peer);
    const System once(text);
    // A PROJ string keeps where the axes point, and their order where one is turned.
    const std::string again = once.to_proj();
    const bool turned = again.find("+axis=") != std::string::npos;
    EXPECT_EQ(turned, text.find("+axis=enu") == text.npos && text.find("+axis=neu") == text.npos);
    for (const System& system : {once, System(again)}) {
      // PROJ's Krovak has one ellipsoid.
      const std::string ellipsoid = text.substr(text.find("+ellps="));
      const Transformation way(System("+proj=longlat " + ellipsoid), system, options);
      Point ours = way.forward({20, 45});
      if (!turned && system.axes() != once.axes()) std::swap(ours.x, ours.y);
      EXPECT_NEAR(ours.x, theirs.xy.x, 1e-4) << text << "; " << again;
      EXPECT_NEAR(ours.y, theirs.xy.y, 1e-4) << text << "; " << again;
    }
  }
  // So are those of a system of the registry: Gusterberg counts southwards, then westwards.
  EXPECT_NE(System("EPSG:8044").to_proj().find("+proj=cass +axis=swu "), std::string::npos);
  proj_context_destroy(context);
}

#else

TEST(TextFormsRegistry, WhatProjWritesIsRead) { GTEST_SKIP() << "PROJ is not on this machine"; }
TEST(TextFormsRegistry, WhatIsWrittenIsTheSamePlaneToProj) {
  GTEST_SKIP() << "PROJ is not on this machine";
}

#endif

}  // namespace
