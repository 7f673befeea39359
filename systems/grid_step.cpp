// Datum steps by grids of longitude and latitude shifts.
#include <filesystem>

#include "makers.hpp"
#include "operation.hpp"
#include "tidewater/grids.hpp"

namespace tidewater::detail {

namespace {

// Where PROJ's grids usually are, after the folders of the caller's.
constexpr const char* kUsualFolders[] = {"/usr/share/proj", "/usr/local/share/proj"};

constexpr double kDegree = kPi / 180;

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
  for (const GridName& grid : operation.grids) {
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
    for (int i = 0; i < block.count; ++i) {
      block.now[i].x = (block.now[i].x - before) * (1 / kDegree);
      block.now[i].y *= 1 / kDegree;
    }
    const Coordinates<double> points = {&block.now[0].x, &block.now[0].y, &block.now[0].z, 3};
    TWstatus words[kBlockSize];
    const auto count = static_cast<std::size_t>(block.count);
    const Summary summary = back ? grid_.inverse(count, points, points, words)
                                 : grid_.forward(count, points, points, words);
    for (int i = 0; i < block.count; ++i) {
      block.now[i].x = block.now[i].x * kDegree + after;
      block.now[i].y *= kDegree;
    }
    if (summary.failed == 0) return;
    for (int i = 0; i < block.count; ++i) {
      if (words[i] != TW_SUCCESS) block.fail(i, words[i]);
    }
  }
  std::string describe() const override { return words_; }

 private:
  ShiftGrid grid_;
  bool reversed_;
  Frame source_, target_;
  std::string words_;
};

}  // namespace

// NTv2 and NADCON.
bool is_shift_grid(int method) { return method == 9615 || method == 9613; }

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

std::unique_ptr<const DatumStep> shift_grid_step(const Link& link, const Frame& source,
                                                 const Frame& target,
                                                 const std::vector<std::string>& folders) {
  const GridFile file = grid_of(link.operation, folders);
  if (file.path.empty()) throw Error(in_words(link) + " needs a grid that was not found.");
  return std::make_unique<ShiftGridStep>(ShiftGrid(file.path), link.reversed != file.reversed,
                                         file.reversed ? target : source,
                                         file.reversed ? source : target, in_words(link));
}

std::unique_ptr<const DatumStep> shift_grid_step(const std::string& file, bool reversed,
                                                 const Frame& source, const Frame& target,
                                                 const std::vector<std::string>& folders) {
  ShiftGrid grid(file, folders_for(file, folders));
  std::string words = (reversed ? "inverse of " : "") + grid.describe() + " " + grid.path();
  return std::make_unique<ShiftGridStep>(std::move(grid), reversed, reversed ? target : source,
                                         reversed ? source : target, std::move(words));
}

}  // namespace tidewater::detail
