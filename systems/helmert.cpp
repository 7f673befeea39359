// Similarity transformations and constant offsets.
#include <array>
#include <cmath>

#include "makers.hpp"
#include "operation.hpp"
#include "system_impl.hpp"

namespace tidewater::detail {

namespace {

constexpr double kYear = 31556925.445;  // seconds, as the registry has it
constexpr double kArcSecond = kPi / (180 * 3600);

// Registry codes of parameters of operations.
constexpr int kTranslation = 8605, kRotation = 8608, kScaleDifference = 8611;
constexpr int kTranslationRate = 1040, kRotationRate = 1043, kScaleRate = 1046,
              kReferenceEpoch = 1047;
constexpr int kPivot[3] = {8617, 8618, 8667};
constexpr int kLatitudeOffset = 8601, kLongitudeOffset = 8602, kHeightOffset = 8603;

enum class Family {
  none,
  translation,
  position_vector,
  coordinate_frame,
  pivoted_frame,
  pivoted_vector,
  offset
};

Family family_of(int method) {
  switch (method) {
    case 9603:
    case 1031:
    case 1035:
      return Family::translation;
    case 9606:
    case 1033:
    case 1037:
    case 1053:
    case 1054:
    case 1055:
    case 1065:
      return Family::position_vector;
    case 9607:
    case 1032:
    case 1038:
    case 1056:
    case 1057:
    case 1058:
    case 1066:
      return Family::coordinate_frame;
    case 9636:
    case 1034:
    case 1039:
      return Family::pivoted_frame;
    case 1061:
    case 1062:
    case 1063:
      return Family::pivoted_vector;
    case 9601:
    case 9619:
    case 9660:
      return Family::offset;
    default:
      return Family::none;
  }
}

bool time_dependent(int method) { return method >= 1053 && method <= 1058; }

// X' = pivot + translation + (1 + s) R (X - pivot) with the matrix of small angles of IOGP
// Publication 373-7-2, section 4.3; the way back takes the transposed matrix, as the registry's
// operations are meant to be reversed.
struct Similarity {
  std::array<double, 3> translation = {}, rotation = {}, pivot = {};  // position vector
  double scale = 0;

  bool changes_nothing() const {
    return translation == std::array<double, 3>{} && rotation == std::array<double, 3>{} &&
           scale == 0;
  }

  void forward(CoordinateTriple& at) const {
    const double x = at.x - pivot[0];
    const double y = at.y - pivot[1];
    const double z = at.z - pivot[2];
    const double m = 1 + scale;
    at.x = m * (x - rotation[2] * y + rotation[1] * z) + (translation[0] + pivot[0]);
    at.y = m * (rotation[2] * x + y - rotation[0] * z) + (translation[1] + pivot[1]);
    at.z = m * (-rotation[1] * x + rotation[0] * y + z) + (translation[2] + pivot[2]);
  }
  void inverse(CoordinateTriple& at) const {
    const double by = 1 / (1 + scale);
    const double x = (at.x - (translation[0] + pivot[0])) * by;
    const double y = (at.y - (translation[1] + pivot[1])) * by;
    const double z = (at.z - (translation[2] + pivot[2])) * by;
    at.x = x + rotation[2] * y - rotation[1] * z + pivot[0];
    at.y = -rotation[2] * x + y + rotation[0] * z + pivot[1];
    at.z = rotation[1] * x - rotation[0] * y + z + pivot[2];
  }
};

Similarity similarity_of(const OperationRecord& operation, double epoch) {
  const Family family = family_of(operation.method);
  Similarity result;
  double years = 0;
  if (time_dependent(operation.method)) years = epoch - value_of(operation, kReferenceEpoch);
  const bool rotates = family != Family::translation;
  const bool frame = family == Family::coordinate_frame || family == Family::pivoted_frame;
  for (int i = 0; i < 3; ++i) {
    const auto k = static_cast<std::size_t>(i);
    result.translation[k] = value_of(operation, kTranslation + i) +
                            value_of(operation, kTranslationRate + i) * kYear * years;
    if (!rotates) continue;
    result.rotation[k] =
        value_of(operation, kRotation + i) + value_of(operation, kRotationRate + i) * kYear * years;
    if (frame) result.rotation[k] = -result.rotation[k];
    result.pivot[k] = value_of(operation, kPivot[i]);
  }
  if (rotates) {
    result.scale =
        value_of(operation, kScaleDifference) + value_of(operation, kScaleRate) * kYear * years;
  }
  return result;
}

void shift_longitudes(Block& block, double by) {
  if (by == 0) return;
  for (int i = 0; i < block.count; ++i) block.now[i].x += by;
}

class SimilarityStep final : public DatumStep {
 public:
  SimilarityStep(const Similarity& map, const Frame& source, const Frame& target, bool reversed,
                 bool flat, std::string words)
      : map_(map),
        source_(source),
        target_(target),
        reversed_(reversed),
        flat_(flat),
        words_(std::move(words)) {}

  void run(Block& block, bool inverse) const override {
    const bool back = inverse != reversed_;
    const Frame& from = back ? target_ : source_;
    const Frame& to = back ? source_ : target_;
    if (flat_) {
      for (int i = 0; i < block.count; ++i) block.now[i].z = 0;
    }
    shift_longitudes(block, -from.meridian);
    TWstatus status;
    TWllh_to_xyz(from.a, from.e, block.count, block.now, block.spare, &status);
    if (back) {
      for (int i = 0; i < block.count; ++i) map_.inverse(block.spare[i]);
    } else {
      for (int i = 0; i < block.count; ++i) map_.forward(block.spare[i]);
    }
    TWxyz_to_llh(to.a, to.e, block.count, block.spare, block.now, &status);
    shift_longitudes(block, to.meridian);
  }
  std::string describe() const override { return words_; }

 private:
  Similarity map_;
  Frame source_, target_;
  bool reversed_, flat_;
  std::string words_;
};

class OffsetStep final : public Step {
 public:
  OffsetStep(double lon, double lat, double height, const Frame& source, const Frame& target,
             bool reversed)
      // Longitudes are from Greenwich here, the offset is between the two meridians' longitudes.
      : lon_(lon - source.meridian + target.meridian),
        lat_(lat),
        height_(height),
        sign_(reversed ? -1 : 1) {}

  void run(Block& block, bool inverse) const override {
    const double sign = inverse ? -sign_ : sign_;
    for (int i = 0; i < block.count; ++i) {
      block.now[i].x += sign * lon_;
      block.now[i].y += sign * lat_;
      block.now[i].z += sign * height_;
    }
  }

 private:
  double lon_, lat_, height_, sign_;
};

}  // namespace

Frame frame_of(const DatumDefinition& datum) {
  const double rf = datum.ellipsoid.inverse_flattening;
  const double f = rf == 0 ? 0 : 1 / rf;
  return {datum.ellipsoid.a, std::sqrt(f * (2 - f)), datum.meridian.longitude};
}

double value_of(const OperationRecord& operation, int code) {
  for (const Parameter& parameter : operation.parameters) {
    if (parameter.code == code) return Registry::shared().base_value(parameter);
  }
  return 0;
}

std::string in_words(const Link& link) {
  return (link.reversed ? "inverse of EPSG:" : "EPSG:") + std::to_string(link.operation.code) +
         " " + link.operation.name;
}

bool is_similarity_or_offset(int method) { return family_of(method) != Family::none; }
bool depends_on_time(int method) { return time_dependent(method); }

std::unique_ptr<const Step> similarity_or_offset(const Link& link, const Frame& source,
                                                 const Frame& target, double epoch, bool flat) {
  const OperationRecord& operation = link.operation;
  if (family_of(operation.method) == Family::offset) {
    return std::make_unique<OffsetStep>(
        value_of(operation, kLongitudeOffset), value_of(operation, kLatitudeOffset),
        value_of(operation, kHeightOffset), source, target, link.reversed);
  }
  const Similarity map = similarity_of(operation, epoch);
  // Two ellipsoids as near as those of GRS 1980 and WGS 84 are within 0.1 mm of each other.
  const bool same = std::fabs(source.a - target.a) < 1e-6 &&
                    std::fabs(source.e - target.e) < 1e-9 && source.meridian == target.meridian;
  if (same && map.changes_nothing()) return nullptr;
  return std::make_unique<SimilarityStep>(map, source, target, link.reversed, flat, in_words(link));
}

std::unique_ptr<const DatumStep> towgs84_step(const DatumDefinition& datum, bool reversed,
                                              bool flat) {
  const auto& seven = *datum.to_wgs84;
  Similarity map;
  for (std::size_t i = 0; i < 3; ++i) {
    map.translation[i] = seven[i];
    map.rotation[i] = seven[3 + i] * kArcSecond;
  }
  map.scale = seven[6] * 1e-6;
  Frame source = frame_of(datum);
  source.meridian = 0;
  const Frame target = frame_of(datum_from_registry(6326));
  std::string words = std::string(reversed ? "inverse of the" : "the") +
                      " parameters to WGS 84 of the definition of " + datum.name;
  return std::make_unique<SimilarityStep>(map, source, target, reversed, flat, std::move(words));
}

}  // namespace tidewater::detail
