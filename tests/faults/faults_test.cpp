// Every allocation and every read failing in turn, in every call that allocates or reads: the call
// fails and says so, or gives what it gives without the fault; nothing is lost, nothing is left
// behind that changes the next call.

#include <gtest/gtest.h>
#include <signal.h>
#include <sys/wait.h>
#include <unistd.h>

#include <chrono>
#include <cmath>
#include <cstdint>
#include <cstdio>
#include <cstring>
#include <functional>
#include <map>
#include <new>
#include <optional>
#include <random>
#include <set>
#include <string>
#include <string_view>
#include <thread>
#include <vector>

#include "builder.hpp"
#include "called.hpp"
#include "csv.hpp"
#include "faults/injected.hpp"
#include "support/data.hpp"
#include "support/grids.hpp"
#include "support/harmonics.hpp"
#include "table_store.hpp"
#include "tidewater/catalogue.h"
#include "tidewater/datum.h"
#include "tidewater/grids.hpp"
#include "tidewater/lines.h"
#include "tidewater/lines.hpp"
#include "tidewater/magnetic_model.hpp"
#include "tidewater/position_text.hpp"
#include "tidewater/special.h"
#include "tidewater/store.h"
#include "tidewater/system.hpp"
#include "tidewater/systems.h"
#include "tidewater/text.h"
#include "tidewater/transformation.hpp"

using namespace tidewater::test;

// The array functions target of the fuzzer: calls by any bytes.
extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size);

namespace {

// A hash of what a call gave, bit by bit; nothing where it said that it failed.  It takes no
// memory.
using Outcome = std::optional<std::uint64_t>;

struct Call {
  const char* name;
  std::function<Outcome()> run;
};

std::ostream& operator<<(std::ostream& out, const Call& call) { return out << call.name; }

class Bits {
 public:
  template <class T>
  Bits& add(const T& value) {
    unsigned char bytes[sizeof value];
    std::memcpy(bytes, &value, sizeof value);
    for (const unsigned char byte : bytes) hash_ = (hash_ ^ byte) * 1099511628211u;  // FNV-1a
    return *this;
  }
  Bits& text(const char* text) {
    for (; *text; ++text) add(*text);
    return *this;
  }
  Outcome when(bool worked) const { return worked ? Outcome(hash_) : std::nullopt; }

 private:
  std::uint64_t hash_ = 14695981039346656037u;
};

// The outcome of a call that may throw what the systems layer throws.
template <class Work>
Outcome unless_thrown(Work work) {
  try {
    return work();
  } catch (const tidewater::Error&) {
  } catch (const tabdll::StoreError&) {
  } catch (const tabdll::SourceError&) {
  } catch (const std::bad_alloc&) {
  }
  return std::nullopt;
}

const char* store_path() { return TIDEWATER_STORE; }

// Grids of every form, and a folder of sources; made once.
struct Files {
  ScratchFolder folder;

  Files() {
    const auto place = [](int r, int c) { return static_cast<float>(0.01 * (3 * r + c)); };
    const GridFile grid = {-80, 30, 30, 30, place};
    for (const char* name : {"g.las", "g.los", "g.geo"}) folder.write(name, grid.bytes());
    GsbFile national;
    national.grids.push_back(
        {"ROOT", "NONE", 30 * 3600.0, 60 * 3600.0, 50 * 3600.0, 80 * 3600.0, 3600, place, place});
    folder.write("n.gsb", national.bytes());
    std::filesystem::create_directories(folder.path() / "nadcon");
    std::filesystem::create_directories(folder.path() / "geoid");
    std::filesystem::create_directories(folder.path() / "national");
    for (const char* name : {"g.las", "g.los"}) {
      std::filesystem::copy_file(folder.path() / name, folder.path() / "nadcon" / name);
    }
    std::filesystem::copy_file(folder.path() / "g.geo", folder.path() / "geoid" / "g.geo");
    std::filesystem::copy_file(folder.path() / "n.gsb", folder.path() / "national" / "n.gsb");
    folder.write("nadcon/area.par", "g\n");
    folder.write("geoid/area.par", "0 2 4 6 8 10 12g\n");
    folder.write("national/area.par", "n\n");
    folder.write("g.tif", tiff());
    std::filesystem::create_directories(folder.path() / "sources");
    folder.write("sources/layouts.csv",
                 "layout,column,type,offset,size\nl,number,int32,0,4\nl,name,text,4,44\n");
    folder.write("sources/tables.csv", "table,layout,file\nvert_datum,l,v.csv\n");
    folder.write("sources/v.csv", "number,name\n1,one\n2,two\n");
  }

  std::string operator/(const char* name) const { return (folder.path() / name).string(); }

 private:
  template <class T>
  static void put(std::string& bytes, T value) {
    bytes.append(reinterpret_cast<const char*>(&value), sizeof value);
  }

  // A TIFF of one strip: 4 by 4 nodes, 10 degrees apart, of two bands.
  static std::string tiff() {
    struct Tag {
      std::uint16_t tag, type;
      std::uint32_t count, value;
    };
    constexpr Tag kTags[] = {
        {256, 3, 1, 4},           {257, 3, 1, 4},      {258, 3, 2, 32 | 32 << 16},
        {259, 3, 1, 1},           {262, 3, 1, 1},      {273, 4, 1, 400},
        {277, 3, 1, 2},           {278, 3, 1, 4},      {279, 4, 1, 128},
        {339, 3, 2, 3 | 3 << 16}, {33550, 12, 3, 300}, {33922, 12, 6, 324}};
    std::string bytes = "II*";
    bytes += std::string(1, 0);
    put(bytes, std::uint32_t{8});
    put(bytes, static_cast<std::uint16_t>(std::size(kTags)));
    for (const Tag& tag : kTags) put(bytes, tag);
    bytes.resize(300);
    for (const double number : {10., 10., 0., 0., 0., 0., 10., 60., 0.}) put(bytes, number);
    bytes.resize(400);
    for (int i = 0; i < 32; ++i) put(bytes, static_cast<float>(0.25 * i));
    return bytes;
  }
};

const Files& files() {
  static const Files made;
  return made;
}

// --- The C library

std::string directory_of(const char* name) { return files() / name + "/"; }

// One point: by contract the word of a failed load stands only until a later point loads again.
Outcome nadcon(bool inverse) {
  static const std::string directory = directory_of("nadcon");
  NadconControl control = {};
  TWstatus status = 0;
  TWnadcon_c(directory.c_str(), &control, &status);
  if (!TW_OK(status)) return std::nullopt;
  // At two ends of the grid, so that each call loads.
  CoordinateTriple p = {degrees(-75.4), degrees(35.3), 1}, q = {degrees(-55.4), degrees(53.3), 1};
  (inverse ? TWnadcon_i : TWnadcon_f)(1, &q, &control, &q, &status);
  if (status != TW_SUCCESS) return std::nullopt;
  (inverse ? TWnadcon_i : TWnadcon_f)(1, &p, &control, &p, &status);
  return Bits().add(p).add(q).when(status == TW_SUCCESS);
}

Outcome geoid(bool inverse) {
  static const std::string directory = directory_of("geoid");
  GeoidControl control = {};
  TWstatus status = 0;
  TWgeo90_c(directory.c_str(), &control, &status);
  if (!TW_OK(status)) return std::nullopt;
  CoordinateTriple p[2] = {{degrees(-78.4), degrees(31.3), 1}, {degrees(-52.4), degrees(57.3), 1}};
  (inverse ? TWgeo90_i : TWgeo90_f)(2, p, &control, p, &status);
  return Bits().add(p).when(status == TW_SUCCESS);
}

Outcome national(bool inverse) {
  static const std::string directory = directory_of("national");
  TWstatus status = 0;
  TWcnt_c(directory.c_str(), 0, &status);
  if (!TW_OK(status)) return std::nullopt;
  CoordinateTriple p[2] = {{degrees(-70.4), degrees(40.3), 1}, {degrees(-51.4), degrees(55.3), 1}};
  (inverse ? TWcnt_i : TWcnt_f)(2, p, 0, p, &status);
  return Bits().add(p).when(status == TW_SUCCESS);
}

// The functions beneath, called by themselves.
Outcome nadcon_window() {
  static const std::string directory = directory_of("nadcon");
  NadconControl control = {};
  NadconWindow window = {};
  TWstatus status = 0;
  TWnadcon_c(directory.c_str(), &control, &status);
  if (!TW_OK(status)) return std::nullopt;
  double lon[16] = {}, lat[16] = {};
  TWloc_grids(-65.4, 45.3, 0, &control, &window, lon, lat, &status);
  return Bits().add(window.xmin).add(lon).add(lat).when(status == TW_SUCCESS);
}

Outcome geoid_window() {
  static const std::string directory = directory_of("geoid");
  GeoidControl control = {};
  GeoidWindow window = {};
  TWstatus status = 0;
  TWgeo90_c(directory.c_str(), &control, &status);
  if (!TW_OK(status)) return std::nullopt;
  static float data[22 * 22];
  int32_t index = 0;
  TWgeo90_local(-65.4, 45.3, 0, &control, &window, data, &index, &status);
  if (status != TW_SUCCESS) return std::nullopt;
  double undulations[2] = {};
  // At two ends of the grid, so that each call loads.
  TWget_geo90(degrees(-78.4), degrees(31.3), 0, &control, &undulations[0], &status);
  if (status != TW_SUCCESS) return std::nullopt;
  TWget_geo90(degrees(-52.4), degrees(57.3), 0, &control, &undulations[1], &status);
  return Bits().add(window.xmin).add(data).add(undulations).when(status == TW_SUCCESS);
}

Outcome national_parts() {
  static const std::string directory = directory_of("national");
  static const std::string path = files() / "n.gsb";
  char name[260] = "", from[9] = "", to[9] = "";
  TWstatus status = 0;
  TWget_cnt_fnam(directory.c_str(), name, &status);
  if (!TW_OK(status)) return std::nullopt;
  TWrd_cnt_fhdr(path.c_str(), 0, &status);
  if (!TW_OK(status)) return std::nullopt;
  TWcnt_to_from(0, from, to, &status);
  double shift[4] = {};
  TWget_cnt_shift({degrees(-70.4), degrees(40.3), 0}, 0, &shift[0], &shift[1], &status);
  if (status != TW_SUCCESS) return std::nullopt;
  // By contract it says nothing of a failure: what it loads is asked for by the next call.
  TWload_cnt_local_grid(0, 500);
  TWget_cnt_shift({degrees(-51.4), degrees(55.3), 0}, 0, &shift[2], &shift[3], &status);
  return Bits().text(name).add(from).add(to).add(shift).when(status == TW_SUCCESS);
}

Outcome satellite_constants() {
  double v[13] = {}, m[2][9] = {}, sums[2] = {};
  TWstatus status = 0;
  TWsom_c(0.0818, 1.7, 0.07, 0.01, 0.2, 4, 9, &v[0], &v[1], &v[2], &v[3], &v[4], m[0], m[1], &v[5],
          &v[6], &v[7], &v[8], &v[9], &v[10], &v[11], &v[12], &sums[0], &sums[1], &sums[0],
          &sums[1], &status);
  return Bits().add(v).when(status == TW_SUCCESS);
}

Outcome spline() {
  const double knots[4] = {0, 1, 3, 4};
  double coefficients[16] = {0, 0, 0, 0, 1, 0, 0, 0, 5, 0, 0, 0, 2};
  TWstatus status = 0;
  TWrobin_csform(knots, coefficients, 4, &status);
  return Bits().add(coefficients).when(status == TW_SUCCESS);
}

Outcome robinson_constants() {
  double knots[19] = {}, y[76] = {}, x[76] = {}, y0 = 0;
  TWstatus status = 0;
  TWrobin_c(knots, y, x, &y0, 0.3, &status);
  return Bits().add(knots).add(y).add(x).add(y0).when(status == TW_SUCCESS);
}

Outcome tolerance_count() {
  const TWtransform square = [](TWcontext, int32_t count, const CoordinateTriple* in,
                                CoordinateTriple* out, TWstatus* status) {
    *status = TW_SUCCESS;
    for (int32_t i = 0; i < count; ++i) out[i] = {in[i].x * 6e6, in[i].y * in[i].y * 6e6, 0};
  };
  int32_t count = 0;
  TWstatus status = 0;
  TWtoler_to_cnt(square, 0, {0, 0.3, 0}, {0.5, 0.9, 0}, 6378137, 0.0818, 1000, 0, &count, &status);
  return Bits().add(count).when(status == TW_SUCCESS);
}

Outcome row_tables() {
  const int32_t epochs[3] = {2, 4, 3};
  double c[31] = {}, s[31] = {};
  double **c_sets[3] = {}, **s_sets[3] = {};
  TWstatus status = 0;
  TWhar_alocCtnm(3, epochs, c, s, c_sets, s_sets, &status);
  if (status != TW_SUCCESS) return std::nullopt;
  Bits bits;
  for (int k = 0; k < 3; ++k) {
    bits.add(c_sets[k][epochs[k]] - c).add(s_sets[k][0] - s);
    std::free(c_sets[k]);
    std::free(s_sets[k]);
  }
  TWhar_aloc_Cnm(3, c, s, c, s, c, s, nullptr, nullptr, nullptr, nullptr, nullptr, nullptr,
                 &status);
  return bits.when(status == TW_SUCCESS);
}

Outcome magnetic_values(bool with_rates) {
  static Synthesis s(3), rates(3);
  static Coefficients c = [] {
    Coefficients made(3);
    Coefficients::fill(made, 5, 1);
    return made;
  }();
  SynthesisCache &k = s.cache, &r = rates.cache;
  k.last_colat = k.last_radius = s.last_lon = r.last_colat = r.last_radius = 1e30;
  const CoordinateTriple p[2] = {{0.1, 0.8, 100}, {2, -0.3, 0}};
  CoordinateTriple field[2] = {}, yearly[2] = {};
  MagneticElements elements[2] = {}, changes[2] = {};
  TWstatus status = 0;
  if (with_rates) {
    TWhar_mag_var(s.N, s.radius, c.C.rows(), c.S.rows(), s.rec_a.rows(), s.rec_b.rows(),
                  k.dC.data(), k.dS.data(), k.lC.data(), k.lS.data(), k.rC.data(), k.rS.data(),
                  k.C.data(), k.S.data(), &k.last_colat, &k.last_radius, &s.last_lon, s.tolerance,
                  &k.tcos, &k.tsin, &k.scale_theta, &k.scale_lambda, &k.scale_r, 3, c.C.rows(),
                  c.S.rows(), r.dC.data(), r.dS.data(), r.lC.data(), r.lS.data(), r.rC.data(),
                  r.rS.data(), r.C.data(), r.S.data(), &r.last_colat, &r.last_radius, &r.tcos,
                  &r.tsin, &r.scale_theta, &r.scale_lambda, &r.scale_r, s.a, s.e, 2, p, field,
                  elements, yearly, changes, &status);
  } else {
    TWhar_mag_val(s.N, s.radius, c.C.rows(), c.S.rows(), s.rec_a.rows(), s.rec_b.rows(),
                  k.dC.data(), k.dS.data(), k.lC.data(), k.lS.data(), k.rC.data(), k.rS.data(),
                  k.C.data(), k.S.data(), &k.last_colat, &k.last_radius, &s.last_lon, s.tolerance,
                  &k.tcos, &k.tsin, &k.scale_theta, &k.scale_lambda, &k.scale_r, s.a, s.e, 2, p,
                  field, elements, &status);
  }
  return Bits().add(field).add(elements).add(yearly).add(changes).when(status == TW_SUCCESS);
}

AngleUnit angle_unit() {
  AngleUnit unit = {};
  std::strcpy(unit.format, "dd:mm:ss");
  unit.factor = kPi / 180 / 3600;
  unit.precision = 3;
  return unit;
}

AngleUnit wide_angle_unit() {
  AngleUnit unit = angle_unit();
  std::memset(unit.format, 0, sizeof unit.format);
  const char16_t form[] = u"dd:mm:ss";
  std::copy(std::begin(form), std::end(form), unit.wide_format);
  return unit;
}

// The texts hold their place on the stack or in strings: no word tells of memory, so that what they
// write is whole, or nothing.
Outcome texts() {
  char text[16][200] = {};
  TWstatus words[16] = {};
  const CoordinateTriple p = {0.1, 0.8, 100};
  const AngleUnit unit = angle_unit();
  int n = 0;
  TWllh_to_ascii(&p, unit, 0, 1, 3, 1, text[n], &words[n]), ++n;
  TWenh_to_ascii(&p, 0, 3, 1, 1, 2, 1, text[n], &words[n]), ++n;
  TWxyz_to_ascii(&p, 3, 1, text[n], &words[n]), ++n;
  TWrad_to_ascii(0.3, unit, 1, text[n], &words[n]), ++n;
  TWmet_to_ascii(1234.5, 2, 1, text[n], &words[n]), ++n;
  TWsq_met_to_ascii(1234.5, 2, 1, text[n], &words[n]), ++n;
  TWcub_met_to_ascii(1234.5, 2, 1, text[n], &words[n]), ++n;
  TWscalr_to_asc(0.99960, 8, text[n], &words[n]), ++n;
  double value[4] = {};
  CoordinateTriple read[3] = {};
  TWascii_to_llh("10:20:30.5E,48:00:01N,12", unit, 0, 1, &read[0], &words[n]), ++n;
  TWascii_to_enh("1,2,3", 0, 1, 1, &read[1], &words[n]), ++n;
  TWascii_to_xyz("1,2,3", 1, &read[2], &words[n]), ++n;
  TWascii_to_rad("10:20:30.5E", unit, 0, &value[0], &words[n]), ++n;
  TWascii_to_met("12.5", 1, &value[1], &words[n]), ++n;
  TWascii_to_sq_met("12.5", 1, &value[2], &words[n]), ++n;
  TWascii_to_cub_met("12.5", 1, &value[3], &words[n]), ++n;
  Bits bits;
  for (int i = 0; i < n; ++i) {
    if (!TW_OK(words[i])) return std::nullopt;
    bits.text(text[i]);
  }
  return bits.add(value).add(read).when(true);
}

Outcome wide_texts() {
  TWchar16 text[4][200] = {}, angle[40] = u"10:20:30.5E";
  TWstatus words[8] = {};
  double value[4] = {};
  const AngleUnit unit = wide_angle_unit();
  TWrad_to_ascii_wide(0.3, unit, 1, text[0], &words[0]);
  TWmet_to_ascii_wide(1234.5, 2, 1, text[1], &words[1]);
  TWsq_met_to_ascii_wide(1234.5, 2, 1, text[2], &words[2]);
  TWcub_met_to_ascii_wide(1234.5, 2, 1, text[3], &words[3]);
  TWascii_to_rad_wide(angle, unit, 0, &value[0], &words[4]);
  TWascii_to_met_wide(u"12.5", 1, &value[1], &words[5]);
  TWascii_to_sq_met_wide(u"12.5", 1, &value[2], &words[6]);
  TWascii_to_cub_met_wide(u"12.5", 1, &value[3], &words[7]);
  for (const TWstatus word : words) {
    if (!TW_OK(word)) return std::nullopt;
  }
  return Bits().add(text).add(value).when(true);
}

Outcome catalogue() {
  int32_t count = 0;
  TWstatus status = 0;
  TWget_cs_cnt(store_path(), -1, &count, &status);
  if (!TW_OK(status)) return std::nullopt;
  static char names[200 * 41];
  std::memset(names, 0, sizeof names);
  TWget_cs_names(store_path(), -1, names, &status);
  if (!TW_OK(status)) return std::nullopt;
  int32_t models = 0;
  TWmag_mdl_cnt(store_path(), &models, &status);
  ZoneRecord zones[200] = {};
  if (TW_OK(status)) TWspcs_get_all(store_path(), 83, zones, &status);
  return Bits().add(count).text(names).add(models).text(names + 41).when(TW_OK(status));
}

// --- The systems layer

template <class Kind>
Outcome shifted(const Kind& kind, double lon, double lat) {
  const tidewater::Point there = kind.forward({lon, lat, 3});
  const tidewater::Point back = kind.inverse(there);
  return Bits().add(there).add(back).when(true);
}

Outcome transformed(const char* source, const char* target, tidewater::Point p,
                    const char* operation = "") {
  return unless_thrown([&]() -> Outcome {
    tidewater::TransformationOptions options;
    options.operation = operation;
    const tidewater::Transformation map{tidewater::System(source), tidewater::System(target),
                                        options};
    return Bits()
        .text(map.describe().c_str())
        .add(map.forward(p))
        .add(map.inverse(map.forward(p)))
        .when(true);
  });
}

// The C interface gives null or 0 and a sentence; nothing leaves it by throwing.
Outcome c_interface() {
  tw_system* source = tw_system_create("EPSG:4326");
  tw_system* target = tw_system_create("EPSG:32630");
  tw_transformation* map =
      source && target ? tw_transformation_create(source, target, nullptr) : nullptr;
  Outcome outcome;
  if (map) {
    double x = -4, y = 48;
    const tw_points points = {&x, &y, nullptr, 1};
    const std::size_t failed = tw_transform(map, 0, 1, &points, &points, nullptr, 1);
    char text[2000] = "", form[2000] = "";
    tw_transformation_describe(map, text, sizeof text);
    const bool written = tw_system_text(target, "wkt2", form, sizeof form) != 0;
    double position[3] = {};
    const bool parsed = tw_parse_position("48 51 24 N 2 21 E", 0, 0, position) == 1;
    char square[40] = "";
    const bool gridded = tw_format_mgrs(2, 48, 5, square, sizeof square) != 0;
    int32_t codes[5] = {};
    const std::size_t found = tw_system_search("lambert 93", codes, 5);
    // A text that could not be made is empty.
    const bool whole = failed == 0 && written && parsed && gridded && found != 0 && text[0] != 0;
    outcome = Bits().add(x).add(y).text(text).text(form).add(position).text(square).add(codes).when(
        whole);
  } else {
    EXPECT_STRNE(tw_last_error(), "");
  }
  tw_transformation_destroy(map);
  tw_system_destroy(target);
  tw_system_destroy(source);
  return outcome;
}

Outcome c_interface_models() {
  tw_magnetic_model* model = tw_magnetic_model_create("WMM2025", 2026.5);
  if (!model) return std::nullopt;
  double x = -4, y = 48, z = 0;
  const tw_points points = {&x, &y, &z, 1};
  tw_magnetic_value value = {};
  const std::size_t failed = tw_magnetic_field(model, 1, &points, &value, nullptr);
  tw_magnetic_model_destroy(model);
  tw_lines* lines = tw_lines_create(0, 6378137, 1 / 298.257);
  if (!lines) return std::nullopt;
  const double lon[4] = {0, 1, 1, 0}, lat[4] = {40, 40, 41, 41};
  double perimeter = 0, area = 0;
  tw_lines_polygon(lines, 4, lon, lat, &perimeter, &area);
  tw_lines_destroy(lines);
  return Bits().add(value).add(perimeter).add(area).when(failed == 0);
}

Outcome wkt_round() {
  return unless_thrown([]() -> Outcome {
    static const std::string text = tidewater::System("EPSG:27572").to_wkt();
    const tidewater::System again(text);
    return Bits().text(again.to_wkt().c_str()).when(true);
  });
}

Outcome built_store() {
  static const std::string target = files() / "built.store";
  std::remove(target.c_str());
  return unless_thrown([]() -> Outcome {
    tabdll::build_store(target, files() / "sources");
    const tabdll::TableStore store(target.c_str());
    return Bits().add(store.tables().size()).when(true);
  });
}

// The store's own reader, which keeps nothing.
Outcome read_store() {
  return unless_thrown([]() -> Outcome {
    const tabdll::TableStore store(store_path());
    return Bits().add(store.tables().size()).add(store.table("system").size()).when(true);
  });
}

const Call kCalls[] = {
    {"TWnadcon_f", [] { return nadcon(false); }},
    {"TWnadcon_i", [] { return nadcon(true); }},
    {"TWgeo90_f", [] { return geoid(false); }},
    {"TWgeo90_i", [] { return geoid(true); }},
    {"TWcnt_f", [] { return national(false); }},
    {"TWcnt_i", [] { return national(true); }},
    {"TWnadcon_c and TWloc_grids", nadcon_window},
    {"TWgeo90_local and TWget_geo90", geoid_window},
    {"TWcnt_ parts", national_parts},
    {"TWsom_c", satellite_constants},
    {"TWrobin_csform", spline},
    {"TWrobin_c", robinson_constants},
    {"TWtoler_to_cnt", tolerance_count},
    {"TWhar_alocCtnm and TWhar_aloc_Cnm", row_tables},
    {"TWhar_mag_val", [] { return magnetic_values(false); }},
    {"TWhar_mag_var", [] { return magnetic_values(true); }},
    {"texts", texts},
    {"wide texts", wide_texts},
    {"catalogue", catalogue},
    {"ShiftGrid of a .gsb",
     [] {
       return unless_thrown(
           [] { return shifted(tidewater::ShiftGrid(files() / "n.gsb"), -70, 40); });
     }},
    {"ShiftGrid of .las and .los",
     [] {
       return unless_thrown(
           [] { return shifted(tidewater::ShiftGrid(files() / "g.las"), -70, 40); });
     }},
    {"GeoidGrid",
     [] {
       return unless_thrown([]() -> Outcome {
         const tidewater::GeoidGrid grid(files() / "g.geo");
         return Bits().add(grid.undulation(-70, 40)).add(grid.undulation(-52.5, 58)).when(true);
       });
     }},
#ifdef TIDEWATER_HAVE_TIFF
    {"ShiftGrid of a .tif",
     [] {
       return unless_thrown(
           [] { return shifted(tidewater::ShiftGrid(files() / "g.tif"), 25, 45); });
     }},
#endif
    {"Transformation by the registry",
     [] {
       return transformed("EPSG:4230", "EPSG:2154", {3, 46, 0});
     }},
    {"Transformation of PROJ strings",
     [] {
       return transformed("+proj=longlat +ellps=intl +towgs84=-87,-98,-121 +no_defs",
                          "+proj=utm +zone=31 +datum=WGS84", {3, 46, 0});
     }},
    {"WKT", wkt_round},
    {"tw_ functions", c_interface},
    {"tw_magnetic_model and tw_lines", c_interface_models},
    {"MagneticModel",
     [] {
       return unless_thrown([]() -> Outcome {
         const tidewater::MagneticModel model("", 2026);
         const tidewater::MagneticValue value = model.field(tidewater::Point{2, 48, 0});
         return Bits().add(value.field).when(!std::isnan(value.field.total));
       });
     }},
    {"build_store", built_store},
    {"TableStore", read_store},
};

// Where there are many calls, every one of the first and the last, and a spread of those between.
std::vector<int> places(int calls) {
  constexpr int kEach = 50;
  std::vector<int> all;
  for (int i = 0; i < calls; ++i) {
    if (i < kEach || i >= calls - kEach / 3 || i % (1 + calls / kEach) == 0) all.push_back(i);
  }
  return all;
}

class Faults : public ::testing::TestWithParam<Call> {
 protected:
  // Fails call after call of a kind; how many were seen to fail.
  void fail_each(Fault fault) {
    const Call& call = GetParam();
    if (fault == Fault::kAllocation && std::strcmp(call.name, "ShiftGrid of a .tif") == 0) {
      GTEST_SKIP() << "libtiff 4.5 itself ends the process by what it could not allocate";
    }
    call.run();  // what is kept for good is made here
    const Outcome whole = call.run();
    ASSERT_TRUE(whole);
    int calls = 0;
    {
      const Injected none(fault, -1, false);
      ASSERT_EQ(call.run(), whole);
      calls = none.calls();
    }
    // Every call allocates; those of files read, and no others.
    ASSERT_EQ(calls > 0, fault == Fault::kAllocation || reads_files());
    int failed = 0;
    for (const bool for_good : {false, true}) {
      for (const int nth : places(calls)) {
        // Twice: what is kept for good, as the texts of errors, is made the first time.
        long before = 0;
        for (int turn = 0; turn < 2; ++turn) {
          before = live_blocks();
          Outcome outcome;
          {
            const Injected injected(fault, nth, for_good);
            outcome = call.run();
          }
          if (!outcome && turn == 0) ++failed;
          // No third way: all of it, or none.
          ASSERT_TRUE(!outcome || outcome == whole)
              << "call " << nth << " of " << calls << (for_good ? " and all after" : "");
          if (holds_a_window()) call.run();
          ASSERT_EQ(call.run(), whole) << "after a fault at " << nth;
        }
        ASSERT_LE(live_blocks(), before + kept_by_design()) << "call " << nth << " of " << calls;
      }
    }
    std::printf("%s: %zu faults of %d calls, %d of them said\n", call.name,
                2 * places(calls).size(), calls, failed);
    RecordProperty("faults", 2 * static_cast<int>(places(calls).size()));
  }

  // By contract the window of a failed load has its new place and its old nodes, so that the same
  // point asked again is answered from them: another load puts that right.
  static bool holds_a_window() {
    const std::string_view name = GetParam().name;
    return name.starts_with("TWnadcon") || name.starts_with("TWgeo90") || name.starts_with("TWcnt");
  }

  static bool reads_files() {
    const std::string_view name = GetParam().name;
    return holds_a_window() || name.starts_with("ShiftGrid") || name.starts_with("GeoidGrid") ||
           name == "build_store" || name == "TableStore";
  }

  // By contract TWcnt_c() leaves each file that it opened open for good, with its tables.
  static long kept_by_design() { return std::strncmp(GetParam().name, "TWcnt_", 6) == 0 ? 24 : 0; }
};

TEST_P(Faults, EveryAllocation) { fail_each(Fault::kAllocation); }
TEST_P(Faults, EveryRead) { fail_each(Fault::kRead); }
TEST_P(Faults, EveryReadShort) { fail_each(Fault::kShortRead); }

INSTANTIATE_TEST_SUITE_P(All, Faults, ::testing::ValuesIn(kCalls), [](const auto& test) {
  std::string name = test.param.name;
  std::erase_if(name, [](unsigned char c) { return !std::isalnum(c); });
  return name;
});

// --- The registry's first load

// What a process tells that has loaded the registry with a fault in it, and then without.
struct Load {
  int calls = 0;       // that could have failed
  int failures = 0;    // that did
  bool whole = false;  // the first answer is what it is without the fault
  bool said = false;   // it was none, with a sentence
  bool again = false;  // the second answer is what it is without the fault
  long blocks = 0;     // held at the end
  std::uint64_t answer = 0;
};

Outcome registry_answer() {
  return unless_thrown([]() -> Outcome {
    const tidewater::System system("EPSG:27572");
    return Bits().text(system.name().c_str()).text(system.to_wkt().c_str()).when(true);
  });
}

// In a child of its own, since a process loads it once.
Load first_load(Fault fault, int nth, bool for_good, const Outcome& whole) {
  int ends[2] = {};
  if (pipe(ends) != 0) return {};
  std::fflush(stdout);
  const pid_t child = fork();
  if (child == 0) {
    Load load;
    {
      const Injected injected(fault, nth, for_good);
      const Outcome first = registry_answer();
      load.whole = first && (!whole || first == whole);
      load.said = !first;
      load.calls = injected.calls();
      load.failures = injected.failures();
    }
    const Outcome second = registry_answer();
    load.again = second && (!whole || second == whole);
    load.answer = second.value_or(0);
    load.blocks = live_blocks();
    _exit(write(ends[1], &load, sizeof load) == sizeof load ? 0 : 1);
  }
  close(ends[1]);
  Load load;
  const bool told = child > 0 && read(ends[0], &load, sizeof load) == sizeof load;
  close(ends[0]);
  int status = 0;
  if (child > 0) waitpid(child, &status, 0);
  if (!told || status != 0) return {};
  return load;
}

void fail_first_load(Fault fault) {
  // Throw once, so that what the language keeps for that is there in all children.
  EXPECT_FALSE(unless_thrown([]() -> Outcome { throw tidewater::Error("x"); }));
  const Load plain = first_load(fault, -1, false, std::nullopt);
  ASSERT_TRUE(plain.whole && plain.again);
  const Outcome whole = plain.answer;
  ASSERT_GT(plain.calls, fault == Fault::kAllocation ? 1000 : 0) << "loaded before";
  int failed = 0, faults = 0;
  for (const bool for_good : {false, true}) {
    for (const int nth : places(plain.calls)) {
      const Load load = first_load(fault, nth, for_good, whole);
      ASSERT_TRUE(load.whole || load.said) << nth << (for_good ? " and all after" : "");
      ASSERT_TRUE(load.again) << nth << (for_good ? " and all after" : "");
      ASSERT_GE(load.failures, 1) << nth;
      // The texts of an error may be kept.
      ASSERT_LE(load.blocks, plain.blocks + 2) << nth << (for_good ? " and all after" : "");
      ++faults;
      failed += load.said ? 1 : 0;
    }
  }
  std::printf("the registry's first load: %d faults of %d calls, %d of them said\n", faults,
              plain.calls, failed);
}

// Before all tests that load it in this process, as those without parameters are.
TEST(RegistryFirstLoad, EveryAllocation) { fail_first_load(Fault::kAllocation); }
TEST(RegistryFirstLoad, EveryRead) { fail_first_load(Fault::kRead); }
TEST(RegistryFirstLoad, EveryReadShort) { fail_first_load(Fault::kShortRead); }

// --- Who allocates

std::set<std::string> called_ones, allocating, reading;
std::optional<Injected> counted;
Fault counted_fault = Fault::kAllocation;

void count_call(const char* function, bool begins) {
  if (begins) {
    counted.emplace(counted_fault, -1, false);
    return;
  }
  const int calls = counted->calls();
  counted.reset();
  called_ones.insert(function);
  if (calls > 0) (counted_fault == Fault::kAllocation ? allocating : reading).insert(function);
}

// Of all functions whose arguments are numbers and points, with any of them.
TEST(WhoAllocates, TheseAlone) {
  on_call = count_call;
  std::mt19937 random(1);
  for (const Fault fault : {Fault::kAllocation, Fault::kRead}) {
    counted_fault = fault;
    for (int i = 0; i < 60 * 40; ++i) {
      std::vector<std::uint8_t> bytes(600);
      for (std::uint8_t& b : bytes) b = static_cast<std::uint8_t>(random() % 200);
      bytes[0] = static_cast<std::uint8_t>(i % 60);
      LLVMFuzzerTestOneInput(bytes.data(), bytes.size());
    }
  }
  on_call = nullptr;
  std::printf("%zu functions called\n", called_ones.size());
  EXPECT_GT(called_ones.size(), 200u);
  EXPECT_EQ(reading, std::set<std::string>());
  // Each of them stands among the calls whose allocations fail in turn.
  EXPECT_EQ(allocating,
            (std::set<std::string>{"TWrobin_c", "TWrobin_csform", "TWsom_c", "TWtoler_to_cnt"}));
}

// --- Signals

// Starts a command with its output in a file, sends it a signal after some time, and waits for it.
void interrupt(const std::vector<std::string>& words, const std::string& output, int signal,
               std::chrono::microseconds after) {
  std::fflush(stdout);
  const pid_t child = fork();
  ASSERT_GE(child, 0);
  if (child == 0) {
    if (!std::freopen(output.c_str(), "w", stdout)) _exit(126);
    std::vector<char*> arguments;
    for (const std::string& word : words) arguments.push_back(const_cast<char*>(word.c_str()));
    arguments.push_back(nullptr);
    execv(arguments[0], arguments.data());
    _exit(127);
  }
  std::this_thread::sleep_for(after);
  kill(child, signal);
  int status = 0;
  ASSERT_EQ(waitpid(child, &status, 0), child);
  if (WIFEXITED(status)) {
    ASSERT_EQ(WEXITSTATUS(status), 0);
  } else {
    ASSERT_EQ(WTERMSIG(status), signal);
  }
}

TEST(Signals, ABuildLeavesTheOldStoreOrTheNewOne) {
  const ScratchFolder folder;
  const std::filesystem::path store = folder.path() / "s.store";
  tabdll::build_store(store, files() / "sources");
  const std::string old_bytes = file_bytes(store);
  std::string rows = "number,name\n";
  for (int i = 1; i < 3000; ++i) rows += std::to_string(i) + ",name\n";
  const ScratchFolder sources;
  for (const char* name : {"layouts.csv", "tables.csv"}) {
    sources.write(name, file_bytes(files() / "sources/" + name));
  }
  sources.write("v.csv", rows);
  tabdll::build_store(folder.path() / "new.store", sources.path());
  const std::string new_bytes = file_bytes(folder.path() / "new.store");
  ASSERT_NE(old_bytes, new_bytes);
  std::filesystem::remove(folder.path() / "new.store");
  int olds = 0, news = 0;
  for (int i = 0; i < 60; ++i) {
    folder.write("s.store", old_bytes);
    interrupt({TWSTORE_COMMAND, "build", store.string(), sources.path().string()}, "/dev/null",
              i % 2 ? SIGTERM : SIGINT, std::chrono::microseconds(500 * i));
    const std::string bytes = file_bytes(store);
    ASSERT_TRUE(bytes == old_bytes || bytes == new_bytes) << i;
    ++(bytes == old_bytes ? olds : news);
    // Nothing is left beside it.
    ASSERT_EQ(std::distance(std::filesystem::directory_iterator(folder.path()), {}), 1) << i;
  }
  std::printf("a build interrupted 60 times: %d times before, %d times after\n", olds, news);
  EXPECT_GT(olds, 0);
}

TEST(Signals, AConversionEndsBetweenWholeBlocksOfLines) {
  const ScratchFolder folder;
  std::string lines;
  for (int i = 0; i < 200'000; ++i) lines += "48.39" + std::to_string(100000 + i) + " -4.49 p\n";
  folder.write("in.txt", lines);
  const std::string in = (folder.path() / "in.txt").string();
  const std::string out = (folder.path() / "out.txt").string();
  const std::vector<std::string> words = {TIDEWATER_COMMAND, "convert", "--to", "utm:30N", in};
  interrupt(words, out, 0, std::chrono::seconds(0));  // no signal
  const std::string whole = file_bytes(out);
  for (int i = 0; i < 20; ++i) {
    interrupt(words, out, i % 2 ? SIGTERM : SIGINT, std::chrono::milliseconds(3 * i));
    const std::string part = file_bytes(out);
    ASSERT_EQ(part, whole.substr(0, part.size())) << i;
  }
}

// The faults themselves: what they fail is seen to fail.
TEST(Injected, Fails) {
  const Injected injected(Fault::kAllocation, 1, false);
  void* first = std::malloc(8);
  void* second = std::malloc(8);
  void* third = std::malloc(8);
  EXPECT_TRUE(first && !second && third);
  EXPECT_EQ(injected.failures(), 1);
  std::free(first);
  std::free(third);
}

}  // namespace
