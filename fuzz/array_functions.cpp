// Every function of the C interface that takes numbers and points, with any doubles and any counts:
// it comes back, writes what it was handed and nothing beside it, sets a word of the library's own,
// and gives a point the same figures alone, among others and in place.  The first byte chooses a
// family; its constants are what its own functions have written, or anything.

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <initializer_list>
#include <limits>
#include <map>
#include <string>
#include <string_view>
#include <vector>

#include "bytes.hpp"
#include "called.hpp"
#include "tidewater/tidewater.h"

void (*on_call)(const char* function, bool begins) = nullptr;

namespace {

constexpr double kPi = 3.14159265358979323846;
constexpr double kSentinel = -7.25e77;
constexpr CoordinateTriple kNothing = {kSentinel, kSentinel, kSentinel};

void fail(const char* function, const char* what) {
  std::fprintf(stderr, "%s: %s\n", function, what);
  std::abort();
}

// A table of so many; arrays of nothing have a place too.
std::size_t terms(int32_t count) { return count > 0 ? static_cast<std::size_t>(count) : 0; }

bool is_among(std::string_view function, std::initializer_list<std::string_view> all) {
  return std::find(all.begin(), all.end(), function) != all.end();
}

// Functions whose points know of each other, by contract.
bool is_of_the_whole_array(std::string_view function) {
  return is_among(
      function,
      {
          "TWortho_s",    // a bad latitude repeats the scale of the point before
          "TWpolycon_s",  // so does one that is not computed
          "TWo_merc_uv_k", "TWo_merc_f", "TWo_merc_i",
          "TWo_merc_s",                 // u and v of the point before
          "TWstereo_i", "TWstereo3_i",  // lon0 is negated anew at each point of the south
      });
}

// Several projections behind one another: a point that fails in one ends it for all.
bool is_chain(std::string_view function) {
  return is_among(function,
                  {"TWstereo3_f", "TWpersp_f", "TWlaborde_f", "TWlaborde_i", "TWlaborde_s",
                   "TWt_merc_xyk", "TWg_schreiber", "TWo_lam_f", "TWo_lam_i", "TWo_lam_s"});
}

// By contract another answer in place: what they read is their output, or the input is changed.
bool is_other_in_place(std::string_view function) {
  return is_among(function,
                  {"TWt_merc_xyk", "TWlabor_s", "TWgaussII_s", "TWg_schreiber", "TWcassini_s",
                   "TWpoly2deg_f", "TWlaborde_s", "TWn_zeal_f", "TWstereo_i"});
}

bool same(double a, double b) {
  return std::memcmp(&a, &b, sizeof a) == 0 || (std::isnan(a) && std::isnan(b));
}

bool same(const CoordinateTriple& a, const CoordinateTriple& b) {
  return same(a.x, b.x) && same(a.y, b.y) && same(a.z, b.z);
}

class Session : public Bytes {
 public:
  using Bytes::Bytes;

  bool wanted() {
    const std::uint8_t b = byte();
    if (b % 32 == 31) numbers_.clear(), tables_.clear();  // other parameters from here on
    return b % 8 != 7;
  }

  double number(const std::string& name) { return *place(name); }

  // Where a function reads and writes the number of that name.
  double* place(const std::string& name) {
    const auto found = numbers_.find(name);
    if (found != numbers_.end()) return &found->second;
    return &numbers_.emplace(name, any(name)).first->second;
  }

  double* table(const std::string& name, std::size_t size) {
    std::vector<double>& values = tables_[name];
    if (values.size() != size) {
      values.resize(size);
      values.shrink_to_fit();
      const std::uint8_t kind = byte();
      for (double& value : values) value = kind == 0 ? 0 : any(name);
    }
    return values.data();
  }

  template <class Int>
  Int whole(const std::string& name) {
    const auto found = wholes_.find(name);
    if (found != wholes_.end()) return static_cast<Int>(found->second);
    const std::uint8_t b = byte();
    const int32_t value = b < 200   ? b % 5 - 1
                          : b < 240 ? b - 220
                                    : static_cast<int32_t>(byte() * 0x01010101u);
    wholes_[name] = value;
    return static_cast<Int>(value);
  }

  template <class Int>
  Int size(const std::string& name, int32_t low, int32_t high) {
    const auto found = wholes_.find(name);
    if (found != wholes_.end()) return static_cast<Int>(found->second);
    const int32_t value = low + byte() % (high - low + 1);
    wholes_[name] = value;
    return static_cast<Int>(value);
  }

  int32_t count() {
    const std::uint8_t b = byte();
    if (b == 255) return std::numeric_limits<int32_t>::min();
    return b % 23 - 1;
  }

  CoordinateTriple point() {
    const double unit = byte() % 4 == 3 ? 3e6 : 1;
    const auto element = [&](const char* name) {
      const double value = any(name);
      return unit == 1 || std::fabs(value) > 10 ? value : value * unit;
    };
    const double x = element("lon"), y = element("lat"), z = element("z");
    return {x, y, z};
  }

  std::vector<CoordinateTriple> some(int32_t count) {
    std::vector<CoordinateTriple> all(terms(count));
    for (CoordinateTriple& p : all) p = point();
    return all;
  }

  static void check_word(const char* function, TWstatus status) {
    if (status >> 16 != 0x0FCF || (status & 0x8000) == 0) fail(function, "no word of the library");
  }

  // An array function: call(count, in, out, status).
  template <class Call>
  void over_points(const char* function, bool input_stays, const Call& call);

 private:
  double any(const std::string& name) {
    static const double kSpecial[] = {0,
                                      -0.0,
                                      1,
                                      -1,
                                      kPi / 2,
                                      -kPi / 2,
                                      kPi,
                                      -kPi,
                                      2 * kPi,
                                      kPi / 4,
                                      std::nextafter(kPi / 2, 0),
                                      std::nextafter(kPi / 2, 2),
                                      kPi / 2 + 1e-13,
                                      kPi / 2 - 1e-13,
                                      kPi / 2 - 1e-11,
                                      -kPi / 2 + 1e-11,
                                      1e-14,
                                      1e-12,
                                      1e-10,
                                      1e-8,
                                      1e-300,
                                      5e-324,
                                      0.9999999999,
                                      std::nextafter(1, 0),
                                      1 + 1e-12,
                                      1e5,
                                      1e9,
                                      1e15,
                                      1e22,
                                      1e154,
                                      1e300,
                                      std::numeric_limits<double>::max(),
                                      -1e300,
                                      std::numeric_limits<double>::infinity(),
                                      -std::numeric_limits<double>::infinity(),
                                      std::numeric_limits<double>::quiet_NaN(),
                                      90,
                                      180,
                                      6378137,
                                      0.0818191908426215};
    const std::uint8_t kind = byte();
    if (kind >= 250) return any_double();
    if (kind >= 200) return kSpecial[byte() % std::size(kSpecial)];
    // What such a number ordinarily is.
    const double part = (byte() * 256 + byte()) / 65535.0;
    if (name == "e") return kind % 4 == 0 ? 0 : kind % 4 == 1 ? 0.0818191908426215 : part;
    if (name == "a") return kind % 2 == 0 ? 1 : 6378137;
    if (name == "e2" || name == "eps") return part * part;
    if (name == "k0" || name == "scale" || name == "s1" || name == "s2") return 0.5 + part;
    if (name == "distance" || name == "spacing") return 2e7 * part * part;
    if (name.rfind("lat", 0) == 0) return kPi * (part - 0.5);
    return (kind % 2 == 0 ? 2 * kPi : 2) * (part - 0.5);
  }

  std::map<std::string, double> numbers_;
  std::map<std::string, std::vector<double>> tables_;
  std::map<std::string, int32_t> wholes_;
};

// Room for points, with sentinels before and behind that must stay.
class Guarded {
 public:
  explicit Guarded(int32_t count) : Guarded(std::vector(terms(count), kNothing)) {}
  explicit Guarded(const std::vector<CoordinateTriple>& points)
      : all_(points.size() + 2 * kGuard, kNothing) {
    std::copy(points.begin(), points.end(), all_.begin() + kGuard);
  }
  ~Guarded() {
    const auto is_whole = [](const CoordinateTriple& p) { return same(p, kNothing); };
    if (!std::all_of(all_.begin(), all_.begin() + kGuard, is_whole) ||
        !std::all_of(all_.end() - kGuard, all_.end(), is_whole)) {
      fail("an array", "written beside it");
    }
  }
  Guarded(const Guarded&) = delete;
  Guarded& operator=(const Guarded&) = delete;

  CoordinateTriple* data() { return all_.data() + kGuard; }
  const CoordinateTriple& operator[](std::size_t i) const { return all_[i + kGuard]; }

 private:
  static constexpr int kGuard = 16;  // as many as the widest block

  std::vector<CoordinateTriple> all_;
};

template <class Call>
void Session::over_points(const char* function, bool input_stays, const Call& call) {
  const int32_t n = count();
  const std::vector<CoordinateTriple> given = some(n);

  // In two arrays.  The input has no room behind it, so that the sanitizers see who reads on.
  std::vector<CoordinateTriple> in = given;
  in.shrink_to_fit();
  Guarded out(std::vector(given.size(), kNothing));
  TWstatus status = 0;
  call(n, in.data(), out.data(), &status);
  check_word(function, status);
  for (std::size_t i = 0; input_stays && i < in.size(); ++i) {
    if (!same(in[i], given[i])) fail(function, "input changed");
  }

  // Each point alone.
  const bool alone = !is_of_the_whole_array(function) && (TW_OK(status) || !is_chain(function));
  for (std::size_t i = 0; alone && i < given.size(); ++i) {
    if (same(out[i], kNothing)) continue;  // left out, or behind one that ended the array
    CoordinateTriple one_in = given[i], one_out = kNothing;
    call(1, &one_in, &one_out, &status);
    if (!same(one_out, out[i])) {
      std::fprintf(stderr, "%zu of %zu: %.17g %.17g %.17g alone %.17g %.17g %.17g\n", i,
                   given.size(), out[i].x, out[i].y, out[i].z, one_out.x, one_out.y, one_out.z);
      fail(function, "another answer alone than among others");
    }
  }

  // In place.
  Guarded both(given);
  call(n, both.data(), both.data(), &status);
  check_word(function, status);
  const auto element = [](double now, double before, double apart) {
    return same(now, same(apart, kSentinel) ? before : apart);
  };
  for (std::size_t i = 0; input_stays && !is_other_in_place(function) && i < given.size(); ++i) {
    if (!element(both[i].x, given[i].x, out[i].x) || !element(both[i].y, given[i].y, out[i].y) ||
        !element(both[i].z, given[i].z, out[i].z)) {
      fail(function, "another answer in place");
    }
  }
}

template <class Call>
void called(const char* function, const Call& call) {
  if (on_call) on_call(function, true);
  call();
  if (on_call) on_call(function, false);
}

struct Family {
  const char* name;
  void (*run)(Session&);
};

#include "array_calls.inc"

// --- What has callbacks and lists of terms

// A plain map for the functions that ask for one; it fails where the context says.
struct Map {
  double lon0, k, limit;
};

void map_points(const Map& map, int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                TWstatus* status) {
  *status = TW_SUCCESS;
  for (int32_t i = 0; i < count; ++i) {
    const CoordinateTriple p = in[i];
    if (std::fabs(p.y) > map.limit) *status = TW_BAD_LATITUDE;
    out[i] = {map.k * (p.x - map.lon0) * std::cos(p.y), map.k * p.y, p.z};
  }
}

void mapped(TWcontext context, int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
            TWstatus* status) {
  map_points(*reinterpret_cast<const Map*>(context), count, in, out, status);
}

void mapped_by_pointer(void* context, int32_t count, const CoordinateTriple* in,
                       CoordinateTriple* out, TWstatus* status) {
  map_points(*static_cast<const Map*>(context), count, in, out, status);
}

void of_callbacks(Session& s) {
  Map map = {s.number("lon0"), s.number("k"), s.number("limit")};
  const auto context = reinterpret_cast<TWcontext>(&map);
  TWstatus status = 0;
  if (s.wanted()) {
    const std::vector<CoordinateTriple> in = s.some(s.count());
    Guarded out(std::vector(in.size(), kNothing));
    const double lon = s.number("lon"), lat = s.number("lat"), unused = s.number("unused");
    called("TWgeneric_i", [&] {
      TWgeneric_i(mapped, context, lon, lat, unused, static_cast<int32_t>(in.size()), in.data(),
                  out.data(), &status);
    });
    s.check_word("TWgeneric_i", status);
  }
  if (s.wanted()) {
    const std::vector<CoordinateTriple> in = s.some(s.count());
    const auto n = static_cast<int32_t>(in.size());
    std::vector<double> records(9 * in.size(), 0), convergence(in.size(), 0);
    const double step0 = s.number("step0"), step1 = s.number("step1"), step2 = s.number("step2");
    const double a = s.number("a"), e = s.number("e");
    called("TWget_jacobian", [&] {
      TWget_jacobian(mapped_by_pointer, &map, step0, step1, step2, n, in.data(), records.data(),
                     &status);
    });
    s.check_word("TWget_jacobian", status);
    Guarded scales(std::vector(in.size(), kNothing)), slopes(std::vector(in.size(), kNothing));
    called("TWJ_to_scales",
           [&] { TWJ_to_scales(a, e, n, in.data(), records.data(), scales.data(), &status); });
    s.check_word("TWJ_to_scales", status);
    called("TWJ_to_slopes", [&] { TWJ_to_slopes(n, records.data(), slopes.data(), &status); });
    called("TWJ_to_merconv",
           [&] { TWJ_to_merconv(n, records.data(), convergence.data(), &status); });
  }
  if (s.wanted()) {
    const std::vector<CoordinateTriple> control = s.some(3);
    double sides[3] = {}, azimuths[3] = {};
    CoordinateTriple plane[3] = {};
    const auto mode = s.whole<int16_t>("mode");
    const double e = s.number("e");
    double *lon_c = s.place("lon_c"), *lat_c = s.place("lat_c"), *turn = s.place("rotation");
    called("TWchamtri_c", [&] {
      TWchamtri_c(mapped, context, mode, e, control.data(), sides, azimuths, plane, lon_c, lat_c,
                  turn, &status);
    });
    s.check_word("TWchamtri_c", status);
  }
  if (s.wanted()) {
    // By contract a tolerance below what the map gives, or a line that jumps at half a turn,
    // doubles the count until memory ends: the
    // map here is smooth and of the size of the Earth's, the tolerance a metre or more.
    const auto ordinary = [](double value, double most) {
      return std::isfinite(value) ? std::fmod(value, most) : 0.5;
    };
    const Map smooth = {0, 6378137, 10};
    const CoordinateTriple start = {ordinary(s.number("lon1"), 1), ordinary(s.number("lat1"), 1),
                                    0};
    const CoordinateTriple end = {ordinary(s.number("lon2"), 1), ordinary(s.number("lat2"), 1), 0};
    int32_t count = 0;
    const double e = ordinary(s.number("e"), 0.3);
    const double tolerance = 1 + std::fabs(ordinary(s.number("t"), 1e6));
    const auto kind = s.whole<int16_t>("kind");
    called("TWtoler_to_cnt", [&] {
      TWtoler_to_cnt(mapped, reinterpret_cast<TWcontext>(&smooth), start, end, 6378137, e,
                     tolerance, kind, &count, &status);
    });
    s.check_word("TWtoler_to_cnt", status);
  }
}

void of_regression(Session& s) {
  std::vector<MreTerm> lists[3];
  for (std::vector<MreTerm>& list : lists) {
    list.resize(s.byte() % 8);
    for (MreTerm& term : list) {
      term = {s.point().x, static_cast<int16_t>(s.byte() % 10), static_cast<int16_t>(s.byte() % 10),
              0};
    }
  }
  const auto direction = s.whole<int16_t>("direction"), range = s.whole<int16_t>("range");
  const double k = s.number("k"), lon = s.number("lon_offset"), lat = s.number("lat_offset");
  s.over_points(
      "TWmre", true, [&](int32_t n, CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
        called("TWmre", [&] {
          TWmre(n, direction, range, static_cast<int32_t>(lists[0].size()),
                static_cast<int32_t>(lists[1].size()), static_cast<int32_t>(lists[2].size()), k,
                lon, lat, lists[0].data(), lists[1].data(), lists[2].data(), in, out, status);
        });
      });
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  Session session(data, size);
  constexpr std::size_t kGenerated = std::size(kFamilies);
  const std::size_t family = session.byte() % (kGenerated + 2);
  if (family < kGenerated) {
    kFamilies[family].run(session);
  } else if (family == kGenerated) {
    of_callbacks(session);
  } else {
    of_regression(session);
  }
  return 0;
}
