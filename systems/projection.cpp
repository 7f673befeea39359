#include "tidewater/projection.hpp"

#include <algorithm>
#include <cmath>
#include <limits>

#include "makers.hpp"
#include "projection_impl.hpp"
#include "registry_names.hpp"

namespace tidewater {

namespace detail {

namespace {

constexpr double kDegree = kPi / 180;

// A latitude this little beyond a pole is rounding.
constexpr double kPoleRounding = 1e-12;

MethodArguments arguments(const Definition& definition) {
  const double a = definition.datum.ellipsoid.a;
  const double f = definition.datum.ellipsoid.inverse_flattening == 0
                       ? 0
                       : 1 / definition.datum.ellipsoid.inverse_flattening;
  const double e2 = f * (2 - f);
  return {definition, a, std::sqrt(e2), e2, f};
}

// An inverse whose result must lead back: some formulas answer with success beyond their map.
// Within `sure` of the plane's origin all points are the map's.
class CheckedFormula final : public Formula {
 public:
  CheckedFormula(std::unique_ptr<const Formula> formula, double sure)
      : Formula(formula->plane), formula_(std::move(formula)), sure2_(sure * sure) {}
  TWstatus forward(int count, const CoordinateTriple* in, CoordinateTriple* out) const override {
    return formula_->forward(count, in, out);
  }
  TWstatus inverse(int count, const CoordinateTriple* in, CoordinateTriple* out) const override {
    const TWstatus word = formula_->inverse(count, in, out);
    if (word != TW_SUCCESS) return word;
    bool sure = true;
    for (int i = 0; i < count; ++i) sure &= in[i].x * in[i].x + in[i].y * in[i].y < sure2_;
    if (sure) return TW_SUCCESS;
    CoordinateTriple back[kBlockSize];
    for (int i = 0; i < count; ++i) {
      if (!(std::fabs(out[i].x) <= kPi + kPoleRounding)) return TW_RANGE_ERROR;
      back[i] = {kNotANumber, kNotANumber, 0};
    }
    formula_->forward(count, out, back);  // where it fails it leaves what is no number
    // In units of the semi-major axis: half a metre is not what it guards against.
    constexpr double kApart = 1e-7;
    for (int i = 0; i < count; ++i) {
      if (!(std::fabs(back[i].x - in[i].x) < kApart && std::fabs(back[i].y - in[i].y) < kApart)) {
        return TW_RANGE_ERROR;
      }
    }
    return TW_SUCCESS;
  }

 private:
  std::unique_ptr<const Formula> formula_;
  double sure2_;
};

// The map of equal area about a point is a disk of a radius near 2, in semi-major axes.
double sure_radius(int method) { return method == 9820 || method == 1027 ? 1 : 0; }

// The methods of our own and those about a point or a parallel, whose maps have an edge.
bool needs_check(int method) {
  // The ends of an orbit's map lie on each other.
  if (method == kSpaceOblique || method == kLandsat) return false;
  return method < 0 || method == 9818 || method == 9827 || method == 9828 || method == 9820 ||
         method == 1027 || method == 9832 || method == 9806 || method == 9840 || method == 1130;
}

void check_values(const Definition& definition, const Method& method) {
  for (const ParameterValue& given : definition.parameters) {
    const ParameterKind* kind = parameter_kind(given.code);
    if (kind == nullptr) continue;
    const auto refuse = [&](const char* why) {
      throw Error(std::string(method.name) + ": the " + std::string(kind->words) + " " + why + ".");
    };
    if (!std::isfinite(given.value)) refuse("is no finite number");
    const bool latitude = kind->words.find("atitude") != std::string_view::npos ||
                          kind->words.find("parallel") != std::string_view::npos;
    if (kind->quantity == Quantity::angle && latitude &&
        std::fabs(given.value) > kHalfPi + kPoleRounding) {
      refuse("lies beyond a pole");
    }
    if (kind->quantity == Quantity::angle && std::fabs(given.value) > 4 * kPi) {
      refuse("is more than two turns");
    }
    if (kind->short_form == "k0" && !(given.value > 0)) refuse("must be above zero");
  }
}

}  // namespace

ProjectionImpl::ProjectionImpl(const Definition& definition)
    : definition_(definition), method_(method_by_code(definition.method)) {
  if (method_ == nullptr) {
    throw Error(
        "There is no formula for the projection method EPSG:" + std::to_string(definition.method) +
        " of " + (definition.name.empty() ? "the system" : definition.name) + ".");
  }
  check_values(definition_, *method_);
  // Parameters that are not given have their usual values.
  for (const MethodParameter& parameter : method_->parameters) {
    const auto& given = definition_.parameters;
    const bool there = std::any_of(given.begin(), given.end(), [&](const ParameterValue& value) {
      return value.code == parameter.code;
    });
    if (there) continue;
    double usual = parameter_kind(parameter.code)->usual;
    if (parameter.code == kRectifiedAngle) usual = definition_.parameter(kAzimuth);
    if (parameter.code == kLat2) usual = definition_.parameter(kLat1);
    definition_.parameters.push_back({parameter.code, usual});
  }
  formula_ = method_->make(arguments(definition_));
  if (needs_check(method_->code)) {
    formula_ =
        std::make_unique<const CheckedFormula>(std::move(formula_), sure_radius(method_->code));
  }
  const Plane& plane = formula_->plane;
  // No scale that a map has is so small that its square is nothing.
  if (!std::isfinite(plane.sx + plane.sy + plane.x0 + plane.y0) || plane.sx * plane.sy == 0) {
    throw Error("The parameters of " + std::string(method_->name) + " do not fit together.");
  }
}

void ProjectionImpl::run(Block& block, bool inverse_way) const {
  if (inverse_way) {
    inverse(block);
  } else {
    forward(block);
  }
}

void ProjectionImpl::forward(Block& block) const {
  const Plane plane = formula_->plane;  // a copy: stores of points could be stores into it
  const int count = block.count;
  CoordinateTriple* const from = block.now;
  bool odd = false;
  for (int i = 0; i < count; ++i) {
    from[i].x = within_half_turn(from[i].x - plane.lon0);
    odd |= !(std::fabs(from[i].y) <= kHalfPi);
  }
  if (odd) {
    for (int i = 0; i < block.count; ++i) {
      double& lat = block.now[i].y;
      if (std::fabs(lat) <= kHalfPi) continue;
      if (std::fabs(lat) <= kHalfPi + kPoleRounding) {
        lat = std::copysign(kHalfPi, lat);
      } else {
        block.fail(i, TW_BAD_LATITUDE);
      }
    }
  }
  if (odd || formula_->forward(block.count, block.now, block.spare) != TW_SUCCESS) {
    one_by_one(block, false);
  }
  CoordinateTriple* const to = block.spare;
  for (int i = 0; i < count; ++i) {
    const CoordinateTriple at = to[i];
    to[i] = {plane.x0 + plane.sx * at.x, plane.y0 + plane.sy * at.y, from[i].z};
  }
  block.swap();
}

void ProjectionImpl::inverse(Block& block) const {
  const Plane plane = formula_->plane;
  const double by_x = 1 / plane.sx;
  const double by_y = 1 / plane.sy;
  bool odd = block.failed;
  for (int i = 0; i < block.count; ++i) {
    block.now[i].x = (block.now[i].x - plane.x0) * by_x;
    block.now[i].y = (block.now[i].y - plane.y0) * by_y;
  }
  if (odd || formula_->inverse(block.count, block.now, block.spare) != TW_SUCCESS) {
    one_by_one(block, true);
  }
  odd = false;
  for (int i = 0; i < block.count; ++i) {
    block.spare[i].x = within_half_turn(block.spare[i].x + plane.lon0);
    block.spare[i].z = block.now[i].z;
    odd |= !(std::fabs(block.spare[i].y) <= kHalfPi);
  }
  block.swap();
  if (!odd) return;
  for (int i = 0; i < block.count; ++i) {
    double& lat = block.now[i].y;
    if (std::fabs(lat) <= kHalfPi) continue;
    if (std::fabs(lat) <= kHalfPi + kPoleRounding) {
      lat = std::copysign(kHalfPi, lat);
    } else {
      block.fail(i, TW_RANGE_ERROR);
    }
  }
}

// Each point by itself, so that one that fails has its own word and disturbs no other.  An
// information word says that an iteration ran out or that a value was held: the result stands if it
// leads back.
void ProjectionImpl::one_by_one(Block& block, bool inverse_way) const {
  for (int i = 0; i < block.count; ++i) {
    CoordinateTriple& out = block.spare[i];
    out = {kNotANumber, kNotANumber, kNotANumber};
    if (block.words[i] != TW_SUCCESS) continue;
    const CoordinateTriple in = block.now[i];
    const TWstatus word =
        inverse_way ? formula_->inverse(1, &in, &out) : formula_->forward(1, &in, &out);
    if (word == TW_SUCCESS) continue;
    if (TW_OK(word) && std::isfinite(out.x) && std::isfinite(out.y)) {
      const CoordinateTriple there = out;
      CoordinateTriple back = {kNotANumber, kNotANumber, kNotANumber};
      const TWstatus again =
          inverse_way ? formula_->forward(1, &there, &back) : formula_->inverse(1, &there, &back);
      constexpr double kLeadsBack = 1e-12;
      if (TW_OK(again) && std::fabs(back.x - in.x) < kLeadsBack &&
          std::fabs(back.y - in.y) < kLeadsBack) {
        continue;
      }
    }
    block.words[i] = word;
    block.failed = true;
    out = {kNotANumber, kNotANumber, kNotANumber};
  }
}

}  // namespace detail

namespace {

using detail::kDegree;

// Degrees to radians and back, with what lies beyond any use refused.
void load_position(Coordinates<const double> in, std::size_t at, detail::Block& block) {
  for (int i = 0; i < block.count; ++i) {
    const auto k = static_cast<std::ptrdiff_t>(at + static_cast<std::size_t>(i)) * in.stride;
    block.now[i] = {in.x[k] * kDegree, in.y[k] * kDegree, in.z == nullptr ? 0 : in.z[k]};
    if (!(std::fabs(in.x[k]) <= 720)) block.fail(i, TW_BAD_LONGITUDE);
    if (!(std::fabs(in.y[k]) <= 91)) block.fail(i, TW_BAD_LATITUDE);
  }
}

void load_plane(Coordinates<const double> in, std::size_t at, detail::Block& block) {
  for (int i = 0; i < block.count; ++i) {
    const auto k = static_cast<std::ptrdiff_t>(at + static_cast<std::size_t>(i)) * in.stride;
    block.now[i] = {in.x[k], in.y[k], in.z == nullptr ? 0 : in.z[k]};
    if (!(std::isfinite(in.x[k]) && std::isfinite(in.y[k]))) block.fail(i, TW_BAD_INPUT);
  }
}

void store_plane(Coordinates<double> out, std::size_t at, const detail::Block& block, double by) {
  for (int i = 0; i < block.count; ++i) {
    const auto k = static_cast<std::ptrdiff_t>(at + static_cast<std::size_t>(i)) * out.stride;
    out.x[k] = block.now[i].x * by;
    out.y[k] = block.now[i].y * by;
    if (out.z != nullptr) out.z[k] = block.now[i].z;
  }
}

std::string in_words(const detail::Method& method) {
  std::string list;
  for (const auto& parameter : method.parameters) {
    const auto* kind = detail::parameter_kind(parameter.code);
    if (!list.empty()) list += ", ";
    list += std::string(kind->words) + " (" + std::string(kind->short_form) + ")";
  }
  return list;
}

detail::Definition defined(std::string_view method_name,
                           const std::vector<std::pair<std::string, double>>& parameters,
                           const Ellipsoid& ellipsoid) {
  const detail::Method* method = nullptr;
  if (method_name.starts_with("EPSG:")) {
    method = detail::method_by_code(std::atoi(std::string(method_name.substr(5)).c_str()));
  }
  if (method == nullptr) method = detail::method_by_words(method_name);
  if (method == nullptr) {
    throw Error("There is no projection method \"" + std::string(method_name) +
                "\"; Projection::methods() lists them all.");
  }
  detail::Definition definition;
  definition.kind = SystemKind::projected;
  definition.datum.ellipsoid = {ellipsoid.name(), ellipsoid.code(), ellipsoid.a(),
                                ellipsoid.inverse_flattening()};
  definition.method = method->code;
  definition.unit = {"metre", 9001, 1};
  definition.axes = "EN";
  for (const auto& [name, value] : parameters) {
    const std::string wanted = detail::folded(name);
    const detail::ParameterKind* found = nullptr;
    for (const auto& parameter : method->parameters) {
      const auto* kind = detail::parameter_kind(parameter.code);
      if (wanted == kind->short_form || wanted == detail::folded(kind->words) ||
          wanted == detail::folded(kind->name) || wanted == detail::folded(parameter.proj) ||
          wanted == detail::folded(parameter.wkt1)) {
        found = kind;
        break;
      }
    }
    if (found == nullptr) {
      throw Error(std::string(method->name) + " has no parameter \"" + name + "\"; it takes " +
                  in_words(*method) + ".");
    }
    definition.parameters.push_back(
        {found->code, found->quantity == detail::Quantity::angle ? value * kDegree : value});
  }
  return definition;
}

}  // namespace

Projection::Projection(std::string_view method,
                       const std::vector<std::pair<std::string, double>>& parameters,
                       const Ellipsoid& ellipsoid)
    : impl_(
          std::make_shared<const detail::ProjectionImpl>(defined(method, parameters, ellipsoid))) {}

std::string Projection::method() const { return std::string(impl_->method().name); }

int Projection::method_code() const { return impl_->method().code; }

std::vector<std::pair<std::string, double>> Projection::parameters() const {
  std::vector<std::pair<std::string, double>> list;
  for (const auto& given : impl_->definition().parameters) {
    const auto* kind = detail::parameter_kind(given.code);
    if (kind == nullptr) continue;
    const bool angle = kind->quantity == detail::Quantity::angle;
    list.emplace_back(kind->name, angle ? given.value / kDegree : given.value);
  }
  return list;
}

std::string Projection::truth() const { return impl_->truth(); }

Ellipsoid Projection::ellipsoid() const {
  const auto& ellipsoid = impl_->definition().datum.ellipsoid;
  return Ellipsoid(ellipsoid.a, ellipsoid.inverse_flattening);
}

Summary Projection::forward(std::size_t count, Coordinates<const double> in,
                            Coordinates<double> out, Run run) const noexcept {
  return detail::run_blocks(
      count, run, [&](std::size_t at, detail::Block& block) { load_position(in, at, block); },
      [&](detail::Block& block) { impl_->run(block, false); },
      [&](std::size_t at, const detail::Block& block) { store_plane(out, at, block, 1); });
}

Summary Projection::inverse(std::size_t count, Coordinates<const double> in,
                            Coordinates<double> out, Run run) const noexcept {
  return detail::run_blocks(
      count, run, [&](std::size_t at, detail::Block& block) { load_plane(in, at, block); },
      [&](detail::Block& block) { impl_->run(block, true); },
      [&](std::size_t at, const detail::Block& block) {
        store_plane(out, at, block, 1 / kDegree);
      });
}

Point Projection::forward(Point point) const noexcept {
  Point out;
  forward(1, {&point.x, &point.y, &point.z}, {&out.x, &out.y, &out.z});
  return out;
}

Point Projection::inverse(Point point) const noexcept {
  Point out;
  inverse(1, {&point.x, &point.y, &point.z}, {&out.x, &out.y, &out.z});
  return out;
}

namespace {

// Central differences to the sixth order, three steps either way in longitude and in latitude.
constexpr double kDifferenceStep = 2e-3;
constexpr double kDifference[3] = {45.0 / 60, -9.0 / 60, 1.0 / 60};

// A block holds so many points with their twelve neighbours.
constexpr int kNeighbours = 12;
constexpr int kFactorsAtOnce = detail::kBlockSize / kNeighbours;

Factors factors_of(const double (&slope)[4], double a, double e2, double lat) {
  const auto [x_lon, y_lon, x_lat, y_lat] = slope;
  const double s = std::sin(lat);
  const double w = 1 - e2 * s * s;
  const double across = a * std::cos(lat) / std::sqrt(w);
  const double along = a * (1 - e2) / (w * std::sqrt(w));
  Factors result{};
  result.meridional = std::hypot(x_lat, y_lat) / along;
  result.parallel = std::hypot(x_lon, y_lon) / across;
  result.areal = std::fabs(x_lon * y_lat - x_lat * y_lon) / (along * across);
  result.convergence = std::atan2(-x_lat, y_lat) / kDegree;
  const double sum2 = result.meridional * result.meridional + result.parallel * result.parallel;
  const double plus = std::sqrt(sum2 + 2 * result.areal);
  const double minus = std::sqrt(std::max(0.0, sum2 - 2 * result.areal));
  result.angular = 2 * std::asin(std::min(1.0, minus / plus)) / kDegree;
  return result;
}

}  // namespace

Summary Projection::factors(std::size_t count, Coordinates<const double> in, Factors* out,
                            Run run) const noexcept {
  constexpr Factors kNone = {detail::kNotANumber, detail::kNotANumber, detail::kNotANumber,
                             detail::kNotANumber, detail::kNotANumber};
  const auto& ellipsoid = impl_->definition().datum.ellipsoid;
  const double f = ellipsoid.inverse_flattening == 0 ? 0 : 1 / ellipsoid.inverse_flattening;
  const double e2 = f * (2 - f);
  const auto range = [&](std::size_t first, std::size_t last) {
    Summary summary;
    for (std::size_t begin = first; begin < last; begin += kFactorsAtOnce) {
      const int points = static_cast<int>(std::min<std::size_t>(kFactorsAtOnce, last - begin));
      CoordinateTriple one[detail::kBlockSize];
      CoordinateTriple other[detail::kBlockSize];
      TWstatus words[detail::kBlockSize];
      std::fill_n(words, detail::kBlockSize, TW_SUCCESS);
      detail::Block block = {points * kNeighbours, one, other, words};
      double lats[kFactorsAtOnce];
      for (int p = 0; p < points; ++p) {
        const auto k = static_cast<std::ptrdiff_t>(begin + static_cast<std::size_t>(p)) * in.stride;
        const double lon = in.x[k] * kDegree;
        const double lat = in.y[k] * kDegree;
        lats[p] = lat;
        for (int j = 0; j < 3; ++j) {
          const double step = (j + 1) * kDifferenceStep;
          CoordinateTriple* at = one + p * kNeighbours + 4 * j;
          at[0] = {lon + step, lat, 0};
          at[1] = {lon - step, lat, 0};
          at[2] = {lon, lat + step, 0};
          at[3] = {lon, lat - step, 0};
        }
      }
      impl_->run(block, false);
      for (int p = 0; p < points; ++p) {
        double slope[4] = {};
        TWstatus word = TW_SUCCESS;
        for (int j = 0; j < kNeighbours; ++j) {
          if (words[p * kNeighbours + j] != TW_SUCCESS) word = words[p * kNeighbours + j];
        }
        for (int j = 0; j < 3; ++j) {
          const CoordinateTriple* at = block.now + p * kNeighbours + 4 * j;
          const double by = kDifference[j] / kDifferenceStep;
          slope[0] += by * (at[0].x - at[1].x);
          slope[1] += by * (at[0].y - at[1].y);
          slope[2] += by * (at[2].x - at[3].x);
          slope[3] += by * (at[2].y - at[3].y);
        }
        Factors result = factors_of(slope, ellipsoid.a, e2, lats[p]);
        const std::size_t k = begin + static_cast<std::size_t>(p);
        if (word == TW_SUCCESS && !std::isfinite(result.areal + result.convergence)) {
          word = TW_RANGE_ERROR;
        }
        if (word != TW_SUCCESS) {
          result = kNone;
          if (summary.failed++ == 0) summary.word = word;
        }
        out[k] = result;
        if (run.status != nullptr) run.status[k] = word;
      }
    }
    return summary;
  };
  return detail::run_ranges(count, run, kFactorsAtOnce, range);
}

Factors Projection::factors(Point point) const noexcept {
  Factors out;
  factors(1, Coordinates<const double>{&point.x, &point.y}, &out);
  return out;
}

std::vector<std::string> Projection::methods() {
  std::vector<std::string> names;
  for (const auto& method : detail::methods()) names.emplace_back(method.name);
  return names;
}

}  // namespace tidewater
