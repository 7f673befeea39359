// Datum steps by grids of longitude and latitude shifts.
#include <filesystem>

#include "grids_content.hpp"
#include "makers.hpp"
#include "operation.hpp"
#include "tidewater/grids.hpp"

namespace tidewater::detail {

namespace {

// Where PROJ's grids usually are, after the folders of the caller's.
constexpr const char* kUsualFolders[] = {"/usr/share/proj", "/usr/local/share/proj"};

constexpr int kNadcon = 9613, kNationalVersion1 = 9614, kNationalVersion2 = 9615;
constexpr int kGeocentricByGrid = 1087;

std::vector<std::string> all_folders(const std::vector<std::string>& folders) {
  std::vector<std::string> all = folders;
  all.insert(all.end(), std::begin(kUsualFolders), std::end(kUsualFolders));
  return all;
}

std::string found(const std::string& name, const std::vector<std::string>& folders) {
  if (name.empty()) return "";
  for (const std::string& folder : all_folders(folders)) {
    std::error_code error;
    const std::filesystem::path path = std::filesystem::path(folder) / name;
    if (std::filesystem::is_regular_file(path, error)) return path.string();
  }
  return "";
}

// "fr_ign_ntf_r93.tif" was "ntf_r93.gsb" before PROJ's grids became GeoTIFF files, and
// "us_nga_egm96_15.tif" was "egm96_15.gtx".
std::string older_name(const std::string& name, const char* extension) {
  const auto country = name.find('_');
  const auto agency = name.find('_', country + 1);
  if (country == std::string::npos || agency == std::string::npos || !name.ends_with(".tif")) {
    return "";
  }
  return name.substr(agency + 1, name.size() - agency - 5) + extension;
}

// The registry's grid, or PROJ's form of it, which may hold the shifts the other way.
struct GridFile {
  std::string path;
  bool reversed = false;
};
GridFile grid_of(const OperationRecord& operation, const std::vector<std::string>& folders) {
  // The registry's own files of these methods are of forms that are not read.
  const bool only_tiff =
      operation.method == kNationalVersion1 || is_geocentric_grid(operation.method);
  for (const GridName& grid : operation.grids) {
    if (only_tiff) {
      if (!grid.proj_name.ends_with(".tif")) continue;
      if (auto path = found(grid.proj_name, folders); !path.empty()) {
        return {std::move(path), grid.proj_reversed};
      }
      continue;
    }
    if (auto path = found(grid.name, folders); !path.empty()) return {std::move(path)};
    for (const std::string& name : {grid.proj_name, older_name(grid.proj_name, ".gsb")}) {
      if (auto path = found(name, folders); !path.empty()) {
        return {std::move(path), grid.proj_reversed};
      }
    }
  }
  return {};
}

class ShiftGridStep final : public DatumStep {
 public:
  ShiftGridStep(ShiftGrid grid, bool reversed, const Frame& source, const Frame& target,
                std::string words)
      : grid_(std::move(grid)),
        reversed_(reversed),
        source_(source),
        target_(target),
        words_(std::move(words)) {}

  void run(Block& block, bool inverse) const override {
    const bool back = inverse != reversed_;
    const double before = (back ? target_ : source_).meridian;
    const double after = (back ? source_ : target_).meridian;
    const GridContent& grid = grid_.content();
    for (int i = 0; i < block.count; ++i) {
      CoordinateTriple& point = block.now[i];
      double x = point.x - before;
      double y = point.y;
      TWstatus word = TW_SUCCESS;
      if (back) {
        int passes = 0;
        word = grid.unshift(&x, &y, &passes);
      } else {
        double dlon = 0;
        double dlat = 0;
        if (!grid.shift(x, y, &dlon, &dlat)) word = TW_I_OUTSIDE_CNT;
        x += dlon;
        y += dlat;
      }
      point.x = x + after;
      point.y = y;
      if (word != TW_SUCCESS) block.fail(i, word);
    }
  }
  std::string describe() const override { return words_; }

 private:
  ShiftGrid grid_;
  bool reversed_;
  Frame source_, target_;
  std::string words_;
};

// Translations of geocentric coordinates that a grid has for the positions of the target: IOGP
// Publication 373-7-2, method 1087.
class GeocentricGridStep final : public Step {
 public:
  GeocentricGridStep(GridContent grid, bool reversed, bool flat, const Frame& source,
                     const Frame& target)
      : grid_(std::move(grid)),
        reversed_(reversed),
        flat_(flat),
        source_(source),
        target_(target) {}

  void run(Block& block, bool inverse) const override {
    const bool back = inverse != reversed_;
    const Frame& from = back ? target_ : source_;
    const Frame& to = back ? source_ : target_;
    for (int i = 0; i < block.count; ++i) {
      CoordinateTriple& point = block.now[i];
      point.x -= from.meridian;
      if (flat_) point.z = 0;
      const TWstatus word = back ? backward(point) : forward(point);
      if (word == TW_SUCCESS) {
        point.x += to.meridian;
      } else {
        block.fail(i, word);
      }
    }
  }

 private:
  static constexpr int kMostPasses = 20;
  static constexpr double kTolerance = 1e-13;  // radians

  // The grid is read where the point comes out.
  TWstatus forward(CoordinateTriple& point) const {
    CoordinateTriple from{};
    TWstatus word;
    TWllh_to_xyz(source_.a, source_.e, 1, &point, &from, &word);
    CoordinateTriple at = point;
    for (int pass = 0; pass < kMostPasses; ++pass) {
      double by[3];
      if (!grid_.translation(at.x, at.y, &by)) return TW_I_OUTSIDE_CNT;
      const CoordinateTriple moved = {from.x + by[0], from.y + by[1], from.z + by[2]};
      CoordinateTriple next{};
      TWxyz_to_llh(target_.a, target_.e, 1, &moved, &next, &word);
      const bool rest =
          std::fabs(next.x - at.x) <= kTolerance && std::fabs(next.y - at.y) <= kTolerance;
      at = next;
      if (rest) {
        point = at;
        return TW_SUCCESS;
      }
    }
    return TW_NOT_CONVERGED;
  }

  TWstatus backward(CoordinateTriple& point) const {
    double by[3];
    if (!grid_.translation(point.x, point.y, &by)) return TW_I_OUTSIDE_CNT;
    CoordinateTriple moved{};
    TWstatus word;
    TWllh_to_xyz(target_.a, target_.e, 1, &point, &moved, &word);
    moved = {moved.x - by[0], moved.y - by[1], moved.z - by[2]};
    TWxyz_to_llh(source_.a, source_.e, 1, &moved, &point, &word);
    return TW_SUCCESS;
  }

  GridContent grid_;
  bool reversed_, flat_;
  Frame source_, target_;
};

}  // namespace

bool is_shift_grid(int method) {
  return method == kNationalVersion2 || method == kNadcon || method == kNationalVersion1 ||
         is_geocentric_grid(method);
}

bool is_geocentric_grid(int method) { return method == kGeocentricByGrid; }

std::string shift_grid_file(const OperationRecord& operation,
                            const std::vector<std::string>& folders) {
  return grid_of(operation, folders).path;
}

// The registry's own files are of many forms, of which the object reads one.
std::string geoid_grid_file(const OperationRecord& operation,
                            const std::vector<std::string>& folders) {
  for (const GridName& grid : operation.grids) {
    for (const std::string& name :
         {grid.name, grid.proj_name, older_name(grid.proj_name, ".gtx")}) {
      if (!name.ends_with(".gtx") && !name.ends_with(".tif")) continue;
      if (auto path = found(name, folders); !path.empty()) return path;
    }
  }
  return "";
}

std::vector<std::string> folders_for(const std::string& file,
                                     const std::vector<std::string>& folders) {
  return file.find('/') != std::string::npos ? std::vector<std::string>{} : all_folders(folders);
}

std::unique_ptr<const Step> shift_grid_step(const Link& link, const Frame& source,
                                            const Frame& target,
                                            const std::vector<std::string>& folders, bool flat) {
  const GridFile file = grid_of(link.operation, folders);
  if (file.path.empty()) throw Error(in_words(link) + " needs a grid that was not found.");
  if (is_geocentric_grid(link.operation.method)) {
    return std::make_unique<GeocentricGridStep>(read_grid(file.path, {}, GridKind::geocentric),
                                                link.reversed, flat, source, target);
  }
  return std::make_unique<ShiftGridStep>(ShiftGrid(file.path), link.reversed != file.reversed,
                                         file.reversed ? target : source,
                                         file.reversed ? source : target, in_words(link));
}

std::unique_ptr<const DatumStep> shift_grid_step(const std::string& file, bool reversed,
                                                 const std::vector<std::string>& folders) {
  ShiftGrid grid(file, folders_for(file, folders));
  std::string words = (reversed ? "inverse of " : "") + grid.describe() + " " + grid.path();
  const Frame greenwich = {};
  return std::make_unique<ShiftGridStep>(std::move(grid), reversed, greenwich, greenwich,
                                         std::move(words));
}

}  // namespace tidewater::detail
