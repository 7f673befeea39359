#include "tidewater/transformation.hpp"

#include <cmath>
#include <cstdio>

#include "makers.hpp"
#include "operation.hpp"
#include "system_impl.hpp"
#include "text_forms_parts.hpp"
#include "words.hpp"

namespace tidewater {

namespace detail {

namespace {

constexpr double kDegree = kPi / 180;

using Steps = std::vector<std::shared_ptr<const Step>>;

void run_steps(const Steps& steps, Block& block, bool inverse) {
  if (inverse) {
    for (auto step = steps.rbegin(); step != steps.rend(); ++step) (*step)->run(block, true);
  } else {
    for (const auto& step : steps) step->run(block, false);
  }
}

// Steps that move positions and leave heights, which are not above the ellipsoid, as they are.
class FlatSteps final : public Step {
 public:
  explicit FlatSteps(Steps steps) : steps_(std::move(steps)) {}
  void run(Block& block, bool inverse) const override {
    double heights[kBlockSize];
    for (int i = 0; i < block.count; ++i) heights[i] = block.now[i].z;
    run_steps(steps_, block, inverse);
    for (int i = 0; i < block.count; ++i) block.now[i].z = heights[i];
  }

 private:
  Steps steps_;
};

bool has_ellipsoidal_height(const Definition& definition) {
  return definition.kind == SystemKind::geographic3d || definition.kind == SystemKind::geocentric;
}

bool has_height(const Definition& definition) {
  return has_ellipsoidal_height(definition) || definition.kind == SystemKind::compound;
}

// Are the heights of two systems above the same surface?
bool same_heights(const Definition& one, const Definition& other) {
  if (has_ellipsoidal_height(one) || has_ellipsoidal_height(other)) {
    return has_ellipsoidal_height(one) && has_ellipsoidal_height(other);
  }
  if (one.vertical_code == other.vertical_code && one.vertical_name == other.vertical_name) {
    return true;
  }
  const auto a = Registry::shared().system(one.vertical_code);
  const auto b = Registry::shared().system(other.vertical_code);
  return a && b && a->datum == b->datum;
}

// Geocentric coordinates to longitude from Greenwich, latitude and height, and back.
class GeocentricStep final : public Step {
 public:
  explicit GeocentricStep(const Frame& frame) : frame_(frame) {}
  void run(Block& block, bool inverse) const override {
    TWstatus status;
    if (inverse) {
      TWllh_to_xyz(frame_.a, frame_.e, block.count, block.now, block.spare, &status);
    } else {
      TWxyz_to_llh(frame_.a, frame_.e, block.count, block.now, block.spare, &status);
    }
    block.swap();
  }

 private:
  Frame frame_;
};

// Turns longitudes from a prime meridian into longitudes from Greenwich.
class MeridianStep final : public Step {
 public:
  explicit MeridianStep(double longitude) : longitude_(longitude) {}
  void run(Block& block, bool inverse) const override {
    const double by = inverse ? -longitude_ : longitude_;
    for (int i = 0; i < block.count; ++i) block.now[i].x += by;
  }

 private:
  double longitude_;
};

}  // namespace

// One end of a transformation: between the caller's arrays and blocks of radians and metres.
struct End {
  SystemKind kind;
  bool angles;           // the first two axes are angles
  bool swapped = false;  // the second axis comes first
  double sx = 1, sy = 1, sz = 1;

  // What the axes' letters say of signs that the projection does not.
  End(const Definition& definition, const TransformationOptions& options)
      : kind(definition.kind), angles(definition.method == 0 && kind != SystemKind::geocentric) {
    if (angles) {
      sx = sy = options.radians ? 1 : kDegree;
    } else if (kind != SystemKind::geocentric) {
      sx = sy = definition.unit.factor;
    }
    if (kind != SystemKind::geocentric && kind != SystemKind::vertical) {
      const std::string_view natural = natural_axes(definition.method);
      for (const char letter : definition.axes.substr(0, 2)) {
        if (natural.find(letter) != natural.npos) continue;
        double& turned = letter == 'E' || letter == 'W' ? sx : sy;
        turned = -turned;
      }
    }
    const bool north_first = definition.axes.starts_with('N') || definition.axes.starts_with('S');
    swapped = options.own_axes && kind != SystemKind::geocentric && north_first;
    if (kind == SystemKind::compound) {
      // Inside, heights count upwards.
      sz = definition.axes.ends_with('D') ? -definition.vertical_unit.factor
                                          : definition.vertical_unit.factor;
    }
  }

  template <class T>
  void load(Coordinates<const T> in, std::size_t at, Block& block) const {
    const std::ptrdiff_t stride = in.stride;
    const T* x = (swapped ? in.y : in.x) + static_cast<std::ptrdiff_t>(at) * stride;
    const T* y = (swapped ? in.x : in.y) + static_cast<std::ptrdiff_t>(at) * stride;
    const double limit_x = angles ? 4 * kPi + 1e-9 : 1e100;
    const double limit_y = angles ? kHalfPi + 1e-12 : 1e100;
    // Copies: stores of points could be stores into the members.
    const double by_x = sx;
    const double by_y = sy;
    const double by_z = in.z == nullptr ? 0 : sz;
    const T* z = in.z == nullptr ? x : in.z + static_cast<std::ptrdiff_t>(at) * stride;
    const int count = block.count;
    CoordinateTriple* const to = block.now;
    bool odd = false;
    for (int i = 0; i < count; ++i) {
      const double px = static_cast<double>(x[i * stride]) * by_x;
      const double py = static_cast<double>(y[i * stride]) * by_y;
      const double pz = static_cast<double>(z[i * stride]) * by_z;
      to[i] = {px, py, pz};
      odd |= !(std::fabs(px) <= limit_x) | !(std::fabs(py) <= limit_y) | !(std::fabs(pz) <= 1e100);
    }
    if (!odd) return;
    for (int i = 0; i < block.count; ++i) {
      const CoordinateTriple p = block.now[i];
      if (!(std::isfinite(p.x) && std::isfinite(p.y) && std::fabs(p.z) <= 1e100)) {
        block.fail(i, TW_BAD_INPUT);
      } else if (!(std::fabs(p.x) <= limit_x)) {
        block.fail(i, angles ? TW_BAD_LONGITUDE : TW_BAD_INPUT);
      } else if (!(std::fabs(p.y) <= limit_y)) {
        block.fail(i, angles ? TW_BAD_LATITUDE : TW_BAD_INPUT);
      }
    }
  }

  template <class T>
  void store(Coordinates<T> out, std::size_t at, const Block& block) const {
    const std::ptrdiff_t stride = out.stride;
    T* x = (swapped ? out.y : out.x) + static_cast<std::ptrdiff_t>(at) * stride;
    T* y = (swapped ? out.x : out.y) + static_cast<std::ptrdiff_t>(at) * stride;
    T* z = out.z == nullptr ? nullptr : out.z + static_cast<std::ptrdiff_t>(at) * stride;
    const double by_x = 1 / sx;
    const double by_y = 1 / sy;
    const double by_z = 1 / sz;
    const int count = block.count;
    const CoordinateTriple* const from = block.now;
    const auto each = [&](const auto& turned) {
      if (z == nullptr) {
        for (int i = 0; i < count; ++i) {
          x[i * stride] = static_cast<T>(turned(from[i].x) * by_x);
          y[i * stride] = static_cast<T>(from[i].y * by_y);
        }
      } else {
        for (int i = 0; i < count; ++i) {
          const CoordinateTriple point = from[i];
          x[i * stride] = static_cast<T>(turned(point.x) * by_x);
          y[i * stride] = static_cast<T>(point.y * by_y);
          z[i * stride] = static_cast<T>(point.z * by_z);
        }
      }
    };
    if (angles) {
      each([](double lon) { return within_half_turn(lon); });
    } else {
      each([](double value) { return value; });
    }
  }
};

class TransformationImpl {
 public:
  TransformationImpl(const System& from, const System& to, const TransformationOptions& options)
      : source(from),
        target(to),
        source_end(from.impl().definition, options),
        target_end(to.impl().definition, options) {
    const Definition& one = from.impl().definition;
    const Definition& other = to.impl().definition;
    area = options.area ? *options.area : Area{};

    enter(from, chain, describe);
    choose_with_heights(one, other, options);
    enter(to, back, leaving);
    close_meridians();
  }

  void run(Block& block, bool inverse) const {
    const auto& first = inverse ? back : chain;
    const auto& last = inverse ? chain : back;
    for (const auto& step : first) step->run(block, false);
    run_steps(middle, block, inverse);
    for (auto step = last.rbegin(); step != last.rend(); ++step) (*step)->run(block, true);
  }

  template <class From, class To>
  Summary apply(std::size_t count, Coordinates<const From> in, Coordinates<To> out, const Run& how,
                bool inverse) const noexcept {
    const End& first = inverse ? target_end : source_end;
    const End& last = inverse ? source_end : target_end;
    return run_blocks(
        count, how, [&](std::size_t at, Block& block) { first.load(in, at, block); },
        [&](Block& block) { run(block, inverse); },
        [&](std::size_t at, const Block& block) { last.store(out, at, block); });
  }

  System source, target;
  End source_end, target_end;
  std::vector<std::string> describe, leaving;
  double accuracy = 0;
  std::string operation;
  Area area;

 private:
  // Positions from one datum to the other; heights go along or, not above the ellipsoid, stay.
  void move(const Definition& one, const Definition& other, const TransformationOptions& options,
            bool on_ellipsoid) {
    flat = on_ellipsoid;
    const std::size_t before = middle.size();
    choose(one, other, options);
    if (!flat || middle.size() == before) return;
    const auto first = middle.begin() + static_cast<std::ptrdiff_t>(before);
    auto steps = std::make_shared<const FlatSteps>(Steps(first, middle.end()));
    middle.erase(first, middle.end());
    middle.push_back(std::move(steps));
  }

  void choose_with_heights(const Definition& one, const Definition& other,
                           const TransformationOptions& options) {
    for (const Definition* end : {&one, &other}) {
      if (end->kind == SystemKind::vertical) {
        throw Error("A height alone is not a position: give " + end->name +
                    " together with a horizontal system, as in \"EPSG:2154+5720\".");
      }
    }
    const bool above_ellipsoid = has_ellipsoidal_height(one) || has_ellipsoidal_height(other);
    if (!has_height(one) || !has_height(other) || same_heights(one, other) ||
        trimmed(options.operation) == "no shift") {
      // Heights of a compound system stay.
      const bool compound = one.kind == SystemKind::compound || other.kind == SystemKind::compound;
      move(one, other, options, compound || !above_ellipsoid);
      return;
    }
    // What the caller has named, of heights and of positions.
    TransformationOptions rest = options;
    rest.operation.clear();
    std::vector<std::string> named_heights;
    for (const std::string& word : words_of(trimmed(options.operation))) {
      if (names_heights(word)) {
        named_heights.push_back(word);
      } else {
        rest.operation += (rest.operation.empty() ? "" : " ") + word;
      }
    }
    const Area wanted = area_of_both(one, other, options);
    const auto go = [&](const Definition& from, const Definition& to, bool on_ellipsoid) {
      if (same_datum(from.datum, to.datum)) return;
      move(from, to, rest, on_ellipsoid);
      rest.operation.clear();
    };

    const auto offsets =
        has_ellipsoidal_height(one) || has_ellipsoidal_height(other)
            ? std::vector<Way>{}
            : height_ways(one.vertical_code, other.vertical_code, one, wanted, options);
    const bool own_offsets = named_heights.size() == 1 && named_heights[0].starts_with("offset:");
    if (own_offsets) {
      tell(named_heights[0]);
      add(offset_grid_step(named_heights[0].substr(7), options.grid_folders));
      accuracy = kNotANumber;
      go(one, other, true);
    } else if (const Way* way = picked(offsets, named_heights); way && way->missing.empty()) {
      const Link& link = way->links[0];
      if (is_offset_grid(link.operation.method)) {
        // The grid is read on the source's positions.
        note(*way);
        add(offset_grid_step(link, options.grid_folders));
        go(one, other, true);
      } else {
        go(one, other, true);
        note(*way);
        add(height_offset_step(link, frame_of(other.datum)));
      }
    } else {
      // Over heights above the ellipsoid.
      std::optional<Leg> first;
      std::optional<Leg> last;
      if (!has_ellipsoidal_height(one)) first = leg(one, false, wanted, options, named_heights);
      if (!has_ellipsoidal_height(other)) last = leg(other, true, wanted, options, named_heights);
      if (first) {
        go(one, first->geographic, true);
        note(first->way);
        add(std::move(first->step));
      }
      go(first ? first->geographic : one, last ? last->geographic : other, false);
      if (last) {
        note(last->way);
        add(std::move(last->step));
        go(last->geographic, other, true);
      }
    }
    if (!rest.operation.empty()) {
      throw Error("There is no change of datum for \"" + rest.operation + "\" between " + one.name +
                  " and " + other.name + ".");
    }
  }

  // From heights above the ellipsoid of a geographic system to those of a vertical one, or back.
  struct Leg {
    Definition geographic;
    Way way;
    std::unique_ptr<const DatumStep> step;
  };

  static bool names_heights(std::string_view word) {
    if (word.starts_with("geoid:") || word.starts_with("offset:")) return true;
    const auto code = registry_code(word.starts_with('-') ? word.substr(1) : word);
    const auto operation_named = code ? Registry::shared().operation(*code) : std::nullopt;
    return operation_named &&
           (is_geoid_grid(operation_named->method) || is_height_offset(operation_named->method) ||
            is_offset_grid(operation_named->method));
  }

  // The best way, or the one that the caller has named; null without one.
  static const Way* picked(const std::vector<Way>& list, const std::vector<std::string>& named) {
    for (const Way& way : list) {
      for (const std::string& word : named) {
        const auto code = registry_code(word.starts_with('-') ? word.substr(1) : word);
        if (code == way.links[0].operation.code) return &way;
      }
      if (named.empty()) return &way;
    }
    return nullptr;
  }

  static Leg leg(const Definition& end, bool to_geoid, const Area& wanted,
                 const TransformationOptions& options, const std::vector<std::string>& named) {
    for (const std::string& word : named) {
      if (!word.starts_with("geoid:")) continue;
      Way way;
      way.name = word;
      way.accuracy = kNotANumber;
      return {end, way, geoid_step(word.substr(6), to_geoid, options.grid_folders)};
    }
    std::vector<Way> list;
    if (end.vertical_code != 0) {
      list = height_ways(to_geoid ? 0 : end.vertical_code, to_geoid ? end.vertical_code : 0, end,
                         wanted, options);
    }
    const Way* way = picked(list, named);
    if (way != nullptr && way->missing.empty()) {
      return {definition_from_registry(geographic_of(way->links[0])), *way,
              geoid_step(way->links[0], options.grid_folders)};
    }
    std::string sentence = "No way is known between heights above the ellipsoid and " +
                           (end.vertical_name.empty() ? "those of " + end.name : end.vertical_name);
    if (!named.empty()) sentence += " by the operation that was named";
    if (way != nullptr) {
      sentence = "The ways between heights above the ellipsoid and " + end.vertical_name +
                 " need what is not there: ";
      const std::size_t shown = named.empty() ? std::min<std::size_t>(3, list.size()) : 1;
      for (std::size_t i = 0; i < shown; ++i) {
        const Way& lacking = named.empty() ? list[i] : *way;
        sentence += (i == 0 ? "" : "; ") + lacking.name + " needs " + lacking.missing;
      }
    }
    throw Error(sentence +
                "; name a grid as \"geoid:file.gtx\", or say \"no shift\" to leave heights and "
                "positions as they are.");
  }

  // What would give this transformation again, a word after the other.
  void tell(const std::string& word) {
    if (!operation.empty()) operation += " ";
    operation += word;
  }
  void tell(const Link& link) {
    tell((link.reversed ? "-EPSG:" : "EPSG:") + std::to_string(link.operation.code));
  }

  // Tells of an operation on heights, or of the caller's grid, whose name is the way's.
  void note(const Way& way) {
    if (way.links.empty()) tell(way.name);
    for (const Link& link : way.links) tell(link);
    accuracy += way.accuracy;
    if (area.name.empty() && !way.area.name.empty()) area = way.area;
  }

  // From a system's coordinates to longitude and latitude from its own prime meridian (from
  // Greenwich for geocentric ones), in a chain that the other end runs backwards.
  void enter(const System& system, Steps& steps, std::vector<std::string>& words) {
    const Definition& definition = system.impl().definition;
    if (definition.kind == SystemKind::geocentric) {
      steps.push_back(std::make_shared<GeocentricStep>(frame_of(definition.datum)));
      words.push_back("geocentric coordinates of " + definition.name);
      return;
    }
    if (system.impl().projection != nullptr) {
      // The step itself goes from positions to the plane.
      class Inverse final : public Step {
       public:
        explicit Inverse(std::shared_ptr<const ProjectionImpl> map) : map_(std::move(map)) {}
        void run(Block& block, bool inverse) const override { map_->run(block, !inverse); }

       private:
        std::shared_ptr<const ProjectionImpl> map_;
      };
      steps.push_back(std::make_shared<Inverse>(system.impl().projection));
      words.push_back(system.method() + " of " + definition.name);
    }
  }

  // Longitudes go over Greenwich where the two meridians differ or an operation stands between.
  void close_meridians() {
    const auto meridian = [](const System& system) {
      const Definition& definition = system.impl().definition;
      return definition.kind == SystemKind::geocentric ? 0 : definition.datum.meridian.longitude;
    };
    const double one = meridian(source);
    const double other = meridian(target);
    if (one == other && middle.empty()) return;
    if (one != 0) chain.push_back(std::make_shared<MeridianStep>(one));
    if (other != 0) back.push_back(std::make_shared<MeridianStep>(other));
    if (one != other) {
      datum_words.push_back("longitudes from " + source.impl().definition.datum.meridian.name +
                            " to longitudes from " + target.impl().definition.datum.meridian.name);
    }
  }

  void take(const Way& way, const TransformationOptions& options) {
    for (const Link& link : way.links) {
      tell(link);
      datum_words.push_back(in_words(link) + " (" +
                            Registry::shared().method_name(link.operation.method) + ")");
      if (auto step = datum_step(link, options, flat)) {
        middle.push_back(std::move(step));
      } else {
        datum_words.back() += ", which changes nothing";
      }
    }
    // An ensemble and its member; the same datum has no name.
    if (way.links.empty() && !way.name.empty()) datum_words.push_back(way.name);
    accuracy += way.accuracy;
    if (!way.area.name.empty()) area = way.area;
  }

  void choose(const Definition& one, const Definition& other,
              const TransformationOptions& options) {
    const std::string_view asked = trimmed(options.operation);
    if (asked == "no shift") {
      if (!same_datum(one.datum, other.datum)) {
        datum_words.push_back("no shift from " + one.datum.name + " to " + other.datum.name +
                              ", as asked");
        accuracy = kNotANumber;
      }
      return;
    }
    if (!asked.empty()) {
      named(asked, one, other, options);
      return;
    }
    if (same_datum(one.datum, other.datum)) return;

    auto list = ways(one, other, options);
    if (!list.empty() && list.front().missing.empty()) {
      take(list.front(), options);
      return;
    }
    if (over_wgs84(one, other, options)) return;

    std::string sentence = "No way is known from the datum " + one.datum.name + " of " + one.name +
                           " to " + other.datum.name + " of " + other.name;
    if (!list.empty()) {
      sentence = "The ways from the datum " + one.datum.name + " to " + other.datum.name +
                 " need what is not there: ";
      for (std::size_t i = 0; i < std::min<std::size_t>(3, list.size()); ++i) {
        sentence += (i == 0 ? "" : "; ") + list[i].name + " needs " + list[i].missing;
      }
    }
    throw Error(sentence +
                "; name an operation, give a grid, or say \"no shift\" to leave positions as they "
                "are.");
  }

  // Through the parameters to WGS 84 that one or both definitions bring along.
  bool over_wgs84(const Definition& one, const Definition& other,
                  const TransformationOptions& options) {
    if (!one.datum.to_wgs84 && !other.datum.to_wgs84) return false;
    const Definition wgs84 = definition_from_registry(4326);
    const auto half = [&](const Definition& from, const Definition& to) -> std::optional<Way> {
      if (same_datum(from.datum, to.datum)) return Way{};
      auto list = ways(from, to, options);
      if (list.empty() || !list.front().missing.empty()) return std::nullopt;
      return std::move(list.front());
    };
    std::optional<Way> first;
    std::optional<Way> second;
    if (!one.datum.to_wgs84 && !(first = half(one, wgs84))) return false;
    if (!other.datum.to_wgs84 && !(second = half(wgs84, other))) return false;
    if (one.datum.to_wgs84) {
      add(towgs84_step(one.datum, false, flat));
    } else {
      take(*first, options);
    }
    if (other.datum.to_wgs84) {
      add(towgs84_step(other.datum, true, flat));
    } else {
      take(*second, options);
    }
    accuracy = kNotANumber;
    return true;
  }

  void add(std::unique_ptr<const DatumStep> step) {
    datum_words.push_back(step->describe());
    middle.push_back(std::move(step));
  }

  // What the caller has named.
  void named(std::string_view asked, const Definition& one, const Definition& other,
             const TransformationOptions& options) {
    for (std::string word : words_of(asked)) {
      bool reversed = word.starts_with('-');
      if (reversed) word.erase(0, 1);
      if (word.starts_with("grid:")) {
        tell((reversed ? "-" : "") + word);
        add(shift_grid_step(word.substr(5), reversed, options.grid_folders));
        accuracy = kNotANumber;
        continue;
      }
      const auto code = registry_code(word);
      const auto operation_named = code ? Registry::shared().operation(*code) : std::nullopt;
      if (!operation_named) {
        throw Error("The registry has no operation \"" + word +
                    "\"; an operation is named as \"EPSG:1671\", a grid as \"grid:file.gsb\".");
      }
      take_named(*operation_named, reversed, one, other, options);
    }
  }

  void take_named(const OperationRecord& record, bool reversed, const Definition& one,
                  const Definition& other, const TransformationOptions& options) {
    take(operation_ways(record, one, other, reversed, options), options);
  }

  static Way operation_ways(const OperationRecord& record, const Definition& one,
                            const Definition& other, bool reversed,
                            const TransformationOptions& options) {
    // Without a sign the direction is that in which the operation fits the systems.
    if (!reversed) {
      const auto datum_of = [](int system) {
        const auto found = Registry::shared().system(system);
        return found ? found->datum : 0;
      };
      const int from = datum_of(record.source);
      const int to = datum_of(record.target);
      reversed = (to == one.datum.code && from != one.datum.code) ||
                 (from == other.datum.code && to != other.datum.code);
    }
    auto way = way_by_operation(record, reversed, options);
    if (!way.missing.empty()) {
      throw Error("EPSG:" + std::to_string(record.code) + ", " + record.name + ", needs " +
                  way.missing + ".");
    }
    return way;
  }

  bool flat = false;  // positions are taken to lie on the ellipsoid
  Steps chain;        // from the source to longitude and latitude from Greenwich
  Steps middle;       // datum steps
  Steps back;         // from the target to the same

 public:
  std::vector<std::string> datum_words;
};

}  // namespace detail

Transformation::Transformation(const System& source, const System& target,
                               const TransformationOptions& options)
    : impl_(std::make_shared<const detail::TransformationImpl>(source, target, options)) {}

#define TIDEWATER_ARRAY_CALLS(From, To)                                          \
  Summary Transformation::forward(std::size_t count, Coordinates<const From> in, \
                                  Coordinates<To> out, Run run) const noexcept { \
    return impl_->apply(count, in, out, run, false);                             \
  }                                                                              \
  Summary Transformation::inverse(std::size_t count, Coordinates<const From> in, \
                                  Coordinates<To> out, Run run) const noexcept { \
    return impl_->apply(count, in, out, run, true);                              \
  }
TIDEWATER_ARRAY_CALLS(double, double)
TIDEWATER_ARRAY_CALLS(float, float)
TIDEWATER_ARRAY_CALLS(float, double)
TIDEWATER_ARRAY_CALLS(double, float)
#undef TIDEWATER_ARRAY_CALLS

Point Transformation::forward(Point point) const noexcept {
  Point out;
  forward(1, Coordinates<const double>{&point.x, &point.y, &point.z},
          Coordinates<double>{&out.x, &out.y, &out.z});
  return out;
}

Point Transformation::inverse(Point point) const noexcept {
  Point out;
  inverse(1, Coordinates<const double>{&point.x, &point.y, &point.z},
          Coordinates<double>{&out.x, &out.y, &out.z});
  return out;
}

const System& Transformation::source() const { return impl_->source; }
const System& Transformation::target() const { return impl_->target; }
double Transformation::accuracy() const { return impl_->accuracy; }
std::string Transformation::operation() const { return impl_->operation; }
Area Transformation::area() const { return impl_->area; }

std::string Transformation::describe() const {
  std::string text;
  int number = 0;
  const auto line = [&](const std::string& words) {
    text += std::to_string(++number) + ". " + words + "\n";
  };
  for (const auto& words : impl_->describe) line("inverse of " + words);
  for (const auto& words : impl_->datum_words) line(words);
  for (const auto& words : impl_->leaving) line(words);
  if (number == 0) line("nothing: both systems are the same");
  if (!impl_->datum_words.empty()) {
    char accuracy[40] = "unknown";
    if (std::isfinite(impl_->accuracy)) {
      std::snprintf(accuracy, sizeof accuracy, "%g m", impl_->accuracy);
    }
    text += "accuracy of the datum step: " + std::string(accuracy) + "\n";
  }
  if (!impl_->area.name.empty()) text += "area: " + impl_->area.name + "\n";
  return text;
}

std::vector<Candidate> Transformation::candidates(const System& source, const System& target,
                                                  const TransformationOptions& options) {
  std::vector<Candidate> list;
  for (const auto& way :
       detail::ways(source.impl().definition, target.impl().definition, options)) {
    Candidate candidate{"", way.name, way.accuracy, way.area, way.missing};
    for (const auto& link : way.links) {
      if (!candidate.steps.empty()) candidate.steps += " ";
      candidate.steps += (link.reversed ? "-EPSG:" : "EPSG:") + std::to_string(link.operation.code);
    }
    list.push_back(std::move(candidate));
  }
  return list;
}

}  // namespace tidewater
