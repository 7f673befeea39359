// Steps between heights: by grids of geoid undulations, by offsets that may lean.
#include <cmath>

#include "grids_content.hpp"
#include "makers.hpp"
#include "operation.hpp"
#include "tidewater/grids.hpp"

namespace tidewater::detail {

namespace {

constexpr int kOffset = 9616, kOffsetAndSlope = 1046;

class UndulationStep final : public DatumStep {
 public:
  UndulationStep(GeoidGrid grid, bool to_geoid, std::string words)
      : grid_(std::move(grid)), to_geoid_(to_geoid), words_(std::move(words)) {}

  void run(Block& block, bool inverse) const override {
    const double sign = inverse != to_geoid_ ? -1 : 1;
    for (int i = 0; i < block.count; ++i) {
      CoordinateTriple& point = block.now[i];
      point.z += sign * grid_.content().undulation(point.x, point.y);
      if (!(std::fabs(point.z) <= std::numeric_limits<double>::max())) {
        block.fail(i, TW_I_OUTSIDE_GEOID);
      }
    }
  }
  std::string describe() const override { return words_; }

 private:
  GeoidGrid grid_;
  bool to_geoid_;
  std::string words_;
};

// Guidance note 7-2 of the registry, methods 9616 and 1046: H2 = H1 + A + I_lat rho (lat - lat0) +
// I_lon nu (lon - lon0) cos lat, the radii of curvature at the point of evaluation.
class HeightOffsetStep final : public DatumStep {
 public:
  HeightOffsetStep(const OperationRecord& operation, const Frame& frame, double sign,
                   std::string words)
      : offset_(sign * value_of(operation, 8603)),
        lat0_(value_of(operation, 8617)),
        lon0_(value_of(operation, 8618)),
        words_(std::move(words)) {
    const double sine = std::sin(lat0_);
    const double w = 1 - frame.e * frame.e * sine * sine;
    const double nu = frame.a / std::sqrt(w);
    along_ = sign * value_of(operation, 8730) * nu * (1 - frame.e * frame.e) / w;
    across_ = sign * value_of(operation, 8731) * nu;
  }

  void run(Block& block, bool inverse) const override {
    const double sign = inverse ? -1 : 1;
    for (int i = 0; i < block.count; ++i) {
      CoordinateTriple& point = block.now[i];
      const double lon = within_half_turn(point.x - lon0_);
      point.z += sign * (offset_ + along_ * (point.y - lat0_) + across_ * lon * std::cos(point.y));
    }
  }
  std::string describe() const override { return words_; }

 private:
  double offset_, lat0_, lon0_, along_, across_;
  std::string words_;
};

}  // namespace

bool is_geoid_grid(int method) {
  switch (method) {
    case 1025:
    case 1030:
    case 1045:
    case 1047:
    case 1048:
    case 1050:
    case 1059:
    case 1060:
    case 1072:
    case 1073:
    case 1081:
    case 1082:
    case 1083:
    case 1099:
    case 1100:
    case 1103:
    case 1105:
    case 1106:
    case 1109:
    case 1110:
      return true;
    default:
      return (method >= 1088 && method <= 1098) || (method >= 9661 && method <= 9665);
  }
}

// Of the forms of such grids the one that is read.
bool is_offset_grid(int method) { return method == 1084; }

std::unique_ptr<const DatumStep> offset_grid_step(const Link& link,
                                                  const std::vector<std::string>& folders) {
  // Offsets are added to heights of the source, undulations taken off those above the ellipsoid.
  return std::make_unique<UndulationStep>(GeoidGrid(geoid_grid_file(link.operation, folders)),
                                          link.reversed, in_words(link));
}

std::unique_ptr<const DatumStep> offset_grid_step(const std::string& file,
                                                  const std::vector<std::string>& folders) {
  GeoidGrid grid(file, folders_for(file, folders));
  std::string words = "heights by offsets of " + grid.describe() + " " + grid.path();
  return std::make_unique<UndulationStep>(std::move(grid), false, std::move(words));
}

bool is_height_offset(int method) { return method == kOffset || method == kOffsetAndSlope; }

std::unique_ptr<const DatumStep> geoid_step(const Link& link,
                                            const std::vector<std::string>& folders) {
  return std::make_unique<UndulationStep>(GeoidGrid(geoid_grid_file(link.operation, folders)),
                                          !link.reversed, in_words(link));
}

std::unique_ptr<const DatumStep> geoid_step(const std::string& file, bool to_geoid,
                                            const std::vector<std::string>& folders) {
  GeoidGrid grid(file, folders_for(file, folders));
  std::string words = "heights by " + grid.describe() + " " + grid.path();
  return std::make_unique<UndulationStep>(std::move(grid), to_geoid, std::move(words));
}

std::unique_ptr<const DatumStep> height_offset_step(const Link& link, const Frame& frame) {
  // The figures count along the axis of the operation's source, which may be a depth's.
  const auto source = Registry::shared().system(link.operation.source);
  const bool down = source && source->axes == "D";
  return std::make_unique<HeightOffsetStep>(
      link.operation, frame, (link.reversed ? -1 : 1) * (down ? -1 : 1), in_words(link));
}

}  // namespace tidewater::detail
