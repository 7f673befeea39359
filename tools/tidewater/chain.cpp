#include "chain.hpp"

#include <algorithm>
#include <charconv>
#include <cmath>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <numbers>
#include <sstream>
#include <stdexcept>

namespace tidewater::command {

namespace {

constexpr double kDegree = std::numbers::pi / 180;
// How far beyond an area of use a position is far outside.
constexpr double kFarOutside = 10;  // degrees
// UTM's reach in latitude.
constexpr double kUtmNorth = 84, kUtmSouth = -80;

std::string lowered(std::string text) {
  for (char& c : text) {
    if (c >= 'A' && c <= 'Z') c = static_cast<char>(c + 32);
  }
  return text;
}

// "utm" without a zone, and what stands behind it.
bool is_zoneless_utm(const std::string& text, std::string& datum) {
  const std::string small = lowered(text);
  if (!small.starts_with("utm")) return false;
  std::size_t at = 3;
  if (at < text.size() && text[at] == ':') ++at;
  while (at < text.size() && text[at] == ' ') ++at;
  if (small.compare(at, 4, "auto") == 0) at += 4;
  while (at < text.size() && text[at] == ' ') ++at;
  if (at < text.size() && text[at] >= '0' && text[at] <= '9') return false;
  if (at == 3 && text.size() > 3) return false;
  datum = text.substr(at);
  return true;
}

bool is_sphere_or_ellipsoid(const System& system) {
  return system.kind() == SystemKind::geographic2d || system.kind() == SystemKind::geographic3d;
}

bool whole_earth(const Area& area) {
  return area.name.empty() ||
         (area.west <= -179.9 && area.east >= 179.9 && area.south <= -89 && area.north >= 89);
}

bool far_outside(const Area& area, double lon, double lat) {
  if (lat < area.south - kFarOutside || lat > area.north + kFarOutside) return true;
  // Meridians run together towards a pole.
  if (area.north >= 85 || area.south <= -85) {
    if (std::fabs(lat) > 60) return false;
  }
  double width = area.east - area.west;
  if (width < 0) width += 360;
  double from_middle = std::fabs(std::remainder(lon - (area.west + width / 2), 360));
  return from_middle > width / 2 + kFarOutside;
}

// The grids that a folder's list names, or a file itself.
std::vector<std::string> grid_files(const std::string& name, const std::string& kind) {
  namespace fs = std::filesystem;
  if (!fs::is_directory(name)) return {name};
  std::ifstream list(fs::path(name) / "area.par");
  std::vector<std::string> files;
  if (list) {
    for (std::string line; std::getline(list, line);) {
      while (!line.empty() && (line.back() == '\r' || line.back() == ' ')) line.pop_back();
      const std::size_t start = line.find_first_not_of(" \t");
      if (start == line.npos || line[start] == '#' || line[start] == '*') continue;
      // The area's name stands behind the grid's, or before it.
      std::istringstream words(line);
      std::string first, found;
      for (std::string word; found.empty() && words >> word;) {
        if (first.empty()) first = word;
        for (const char* ending : {"", ".gsb", ".las", ".geo", ".gtx", ".tif"}) {
          const fs::path path = fs::path(name) / (word + ending);
          std::error_code error;
          if (found.empty() && fs::is_regular_file(path, error)) found = path.string();
        }
      }
      files.push_back(found.empty() ? (fs::path(name) / first).string() : found);
    }
  } else {
    for (const auto& entry : fs::directory_iterator(name)) {
      const std::string ending = entry.path().extension().string();
      const bool fits = kind == "shift" ? ending == ".gsb" || ending == ".las" || ending == ".tif"
                                        : ending == ".gtx" || ending == ".geo" || ending == ".tif";
      if (fits) files.push_back(entry.path().string());
    }
    std::sort(files.begin(), files.end());
  }
  if (files.empty()) {
    throw std::runtime_error(name +
                             ": there are no grids in this folder, and no area.par names any");
  }
  return files;
}

TransformationOptions no_shift() {
  TransformationOptions options;
  options.operation = "no shift";
  return options;
}

System geocentric_on(const Ellipsoid& figure) {
  std::string words = figure_text(figure);
  words.insert(words.find(' ') + 1, "+");
  return System("+proj=geocent +" + words);
}

System plain_geographic(const Ellipsoid& figure) {
  return System("geographic " + figure_text(figure));
}

}  // namespace

std::string figure_text(const Ellipsoid& ellipsoid) {
  char text[100];
  char* end = std::to_chars(text, text + 40, ellipsoid.a()).ptr;
  std::string words = "a=" + std::string(text, end);
  if (ellipsoid.inverse_flattening() != 0) {
    end = std::to_chars(text, text + 40, ellipsoid.inverse_flattening()).ptr;
    words += " rf=" + std::string(text, end);
  } else {
    words += " b=" + std::string(text, end);
  }
  return words;
}

Ellipsoid find_ellipsoid(const std::string& text) {
  const std::size_t comma = text.find(',');
  if (comma != text.npos) {
    double a = 0, rf = 0;
    const char* const end = text.data() + text.size();
    const auto one = std::from_chars(text.data(), end, a);
    const auto two = std::from_chars(text.data() + comma + 1, end, rf);
    if (one.ptr == text.data() + comma && two.ptr == end && two.ec == std::errc()) {
      return Ellipsoid(a, rf);
    }
  }
  // The authalic sphere of Clarke 1866.
  if (lowered(text) == "sphere") return Ellipsoid(6370997, 0);
  return Ellipsoid(text);
}

std::optional<Transformation> to_position(const System& system) {
  if (is_sphere_or_ellipsoid(system) && system.meridian().longitude() == 0) return std::nullopt;
  return Transformation(system, plain_geographic(system.ellipsoid()), no_shift());
}

Side::Side(const std::string& text, const std::string& other,
           const std::optional<Ellipsoid>& figure) {
  const std::string small = lowered(text);
  std::string datum;
  zones_figure_ = figure;
  if (small == "mgrs" || small == "usng") {
    kind_ = Kind::military;
    system_ = System("wgs84");
  } else if (is_zoneless_utm(text, datum)) {
    kind_ = Kind::grid;
    zones_on_ = datum;
    system_ = figure ? plain_geographic(*figure)
                     : System(datum.empty() ? "wgs84" : "geographic datum=" + datum);
  } else if (small == "geodetic" || small == "geographic" || small == "geocentric") {
    // On the ellipsoid or the datum of the other side.
    const bool geocentric = small == "geocentric";
    std::string base = other;
    std::string other_datum;
    if (is_zoneless_utm(other, other_datum)) base = other_datum;
    const std::string plain = lowered(base);
    if (base.empty() || plain == "mgrs" || plain == "geodetic" || plain == "geographic" ||
        plain == "geocentric") {
      base = "wgs84";
    }
    if (figure) {
      system_ = geocentric ? geocentric_on(*figure) : plain_geographic(*figure);
    } else if (geocentric) {
      system_ = System("geocentric:" + base);
    } else {
      System known(base);
      if (known.kind() == SystemKind::projected || known.kind() == SystemKind::geocentric) {
        nameless_datum_ = known.code() == 0;
        system_ = known.code() != 0
                      ? System("geographic datum=EPSG:" + std::to_string(known.code()))
                      : plain_geographic(known.ellipsoid());
      } else {
        system_ = std::move(known);
      }
    }
  } else if (figure && small.starts_with("utm:")) {
    kind_ = Kind::plane;
    int zone = 0;
    const auto [end, error] = std::from_chars(text.data() + 4, text.data() + text.size(), zone);
    const std::string_view letter(end, static_cast<std::size_t>(text.data() + text.size() - end));
    const bool south = letter == "S" || letter == "s";
    if (error != std::errc() || zone < 1 || zone > 60 ||
        (!south && letter != "N" && letter != "n")) {
      throw std::invalid_argument("no such zone: " + text.substr(4) +
                                  " (auto, or 1N to 60N, 1S to 60S)");
    }
    system_ =
        System("transverse mercator lat0=0 lon0=" + std::to_string(zone * 6 - 183) +
               " k0=0.9996 x0=500000 y0=" + (south ? "10000000 " : "0 ") + figure_text(*figure));
  } else {
    system_ = System(text);
  }
  if (kind_ == Kind::plane) {
    if (is_sphere_or_ellipsoid(*system_)) kind_ = Kind::angles;
    if (system_->kind() == SystemKind::geocentric) kind_ = Kind::space;
    if (system_->kind() == SystemKind::compound && system_->method().empty()) kind_ = Kind::angles;
  }
}

bool Side::has_height() const {
  return system_->kind() == SystemKind::geographic3d || system_->kind() == SystemKind::geocentric ||
         system_->kind() == SystemKind::compound;
}

std::string Side::name() const {
  if (kind_ == Kind::military) return "military grid references";
  if (kind_ == Kind::grid) return "UTM on " + system_->name();
  return system_->name();
}

const Transformation& Side::zone(int number) const {
  const std::lock_guard lock(zones_->lock);
  auto& known = zones_->known[static_cast<std::size_t>(std::int64_t{number} + 60)];
  if (!known) {
    std::string name = std::to_string(std::abs(number)) + (number < 0 ? "S" : "N");
    const Side side =
        zones_figure_ ? Side("utm:" + name, "", zones_figure_)
                      : Side("utm:" + name + (zones_on_.empty() ? "" : " " + zones_on_), "", {});
    known.emplace(*system_, side.system(), no_shift());
  }
  return *known;
}

Chain::Chain(const ChainRequest& request)
    : request_(request),
      source_(request.from, request.to,
              request.from_ellipsoid ? request.from_ellipsoid : request.to_ellipsoid),
      target_(request.to, request.from, request.to_ellipsoid) {
  const bool own_step = !request.grids.empty() || !request.shift.empty();
  const bool same_figure = request.to_ellipsoid && request.shift.empty();
  if (!request.operation.empty() && own_step) {
    throw std::invalid_argument("--operation and --no-shift exclude a shift of your own");
  }
  if (own_step) {
    for (const std::string& name : request.grids) {
      for (const std::string& file : grid_files(name, "shift")) grids_.emplace_back(file);
    }
    if (!request.shift.empty()) {
      ShiftRequest shift;
      shift.text = request.shift;
      shift.inverse = request.inverse;
      if (request.from_ellipsoid) {
        shift.from = *request.from_ellipsoid;
        shift.to = request.to_ellipsoid ? *request.to_ellipsoid : Ellipsoid("GRS 1980");
      }
      formulas_ = make_datum_shift(shift);
    }
    enter_ = to_position(source_.system());
    if (target_.kind() != Kind::angles || target_.system().meridian().longitude() != 0) {
      if (auto back = to_position(target_.system())) {
        leave_.emplace(plain_geographic(target_.system().ellipsoid()), target_.system(),
                       no_shift());
      }
    }
  } else {
    TransformationOptions options;
    options.operation = request.operation;
    const bool one_datum = source_.nameless_datum() || target_.nameless_datum();
    if (same_figure || (one_datum && request.operation.empty())) options.operation = "no shift";
    options.epoch = request.epoch;
    whole_.emplace(source_.system(), target_.system(), options);
  }
  if (!request.geoid.empty()) {
    const auto files = grid_files(request.geoid, "geoid");
    geoid_.emplace(files.front());
    for (std::size_t i = 1; i < files.size(); ++i) more_geoids_.emplace_back(files[i]);
    source_position_ = to_position(source_.system());
    target_position_ = to_position(target_.system());
  }
  if (!request.anywhere) {
    for (const System* system : {&source_.system(), &target_.system()}) {
      if (system->kind() == SystemKind::geocentric) continue;
      const Area area = system->area();
      if (!whole_earth(area)) areas_.push_back(area);
    }
    if (whole_ && !whole_->operation().empty() && !whole_earth(whole_->area())) {
      areas_.push_back(whole_->area());
    }
    areas_before_ = source_.kind() != Kind::plane && source_.kind() != Kind::space;
    if (!areas_.empty() && !areas_before_ && target_.kind() == Kind::plane && !source_position_) {
      source_position_ = to_position(source_.system());
    }
  }
}

bool Chain::uses_heights() const {
  return source_.has_height() || target_.has_height() || geoid_ || formulas_;
}

void Chain::apply(const Transformation& way, Batch& batch) const {
  Stage stage(batch.count);
  Run run;
  run.status = stage.data();
  const Summary summary = way.forward(
      batch.count, Coordinates<const double>{batch.x.data(), batch.y.data(), batch.z.data()},
      Coordinates<double>{batch.x.data(), batch.y.data(), batch.z.data()}, run);
  if (summary) return;
  for (std::size_t i = 0; i < batch.count; ++i) {
    if (batch.status[i] == TW_SUCCESS) batch.status[i] = stage[i];
  }
}

void Chain::run_zones(Batch& batch, bool inverse) const {
  const Side& side = inverse ? source_ : target_;
  for (std::size_t i = 0; i < batch.count; ++i) {
    if (inverse || batch.status[i] != TW_SUCCESS) continue;
    if (!(batch.y[i] >= kUtmSouth && batch.y[i] <= kUtmNorth)) {
      batch.status[i] = TW_BAD_LATITUDE;
      if (std::fabs(batch.y[i]) <= 90) {
        batch.reason[i] =
            "outside UTM's latitudes, 80 S to 84 N; --to ups:N and ups:S serve the poles";
      }
      continue;
    }
    const int zone = utm_zone(batch.x[i], batch.y[i]);
    batch.zone[i] = batch.y[i] < 0 ? -zone : zone;
  }
  // Points of one zone that follow one another go through one call.
  std::vector<TWstatus> stage(batch.count);
  for (std::size_t from = 0; from < batch.count;) {
    if (batch.status[from] != TW_SUCCESS) {
      ++from;
      continue;
    }
    std::size_t to = from + 1;
    while (to < batch.count && batch.status[to] == TW_SUCCESS && batch.zone[to] == batch.zone[from])
      ++to;
    const Transformation& way = side.zone(batch.zone[from]);
    const Coordinates<double> view = {batch.x.data() + from, batch.y.data() + from,
                                      batch.z.data() + from};
    Run run;
    run.status = stage.data();
    if (!(inverse ? way.inverse(to - from, view, view, run)
                  : way.forward(to - from, view, view, run))) {
      for (std::size_t i = from; i < to; ++i) batch.status[i] = stage[i - from];
    }
    from = to;
  }
}

void Chain::run_grids(Batch& batch) const {
  for (std::size_t i = 0; i < batch.count; ++i) {
    if (batch.status[i] != TW_SUCCESS) continue;
    // The first grid that holds the point serves it.
    Point shifted = {std::nan(""), 0, 0};
    for (const ShiftGrid& grid : grids_) {
      const Point point = {batch.x[i], batch.y[i], batch.z[i]};
      shifted = request_.inverse ? grid.inverse(point) : grid.forward(point);
      if (std::isfinite(shifted.x)) break;
    }
    if (std::isfinite(shifted.x)) {
      batch.x[i] = shifted.x;
      batch.y[i] = shifted.y;
    } else {
      batch.status[i] = std::fabs(batch.y[i]) > 90 ? TW_BAD_LATITUDE : TW_I_OUTSIDE_CNT;
      if (std::fabs(batch.x[i]) > 360) batch.status[i] = TW_BAD_LONGITUDE;
    }
  }
}

void Chain::run_formulas(Batch& batch) const {
  for (std::size_t i = 0; i < batch.count; ++i) {
    if (batch.status[i] != TW_SUCCESS) continue;
    if (!(std::fabs(batch.y[i]) <= 90) || !(std::fabs(batch.x[i]) <= 360)) {
      batch.status[i] = std::fabs(batch.y[i]) <= 90 ? TW_BAD_LONGITUDE : TW_BAD_LATITUDE;
      continue;
    }
    CoordinateTriple point = {batch.x[i] * kDegree, batch.y[i] * kDegree, batch.z[i]};
    batch.status[i] = formulas_->run(1, &point);
    batch.x[i] = point.x / kDegree;
    batch.y[i] = point.y / kDegree;
    batch.z[i] = point.z;
  }
}

void Chain::run_geoid(Batch& batch, const std::optional<Transformation>& position,
                      double sign) const {
  for (std::size_t i = 0; i < batch.count; ++i) {
    if (!batch.has_z[i] || batch.status[i] != TW_SUCCESS) continue;
    Point at = {batch.x[i], batch.y[i], batch.z[i]};
    if (position) at = position->forward(at);
    double n = geoid_->undulation(at.x, at.y);
    for (std::size_t g = 0; g < more_geoids_.size() && !std::isfinite(n); ++g) {
      n = more_geoids_[g].undulation(at.x, at.y);
    }
    if (std::isfinite(n)) {
      batch.z[i] += sign * n;
    } else {
      batch.status[i] = TW_I_OUTSIDE_GEOID;
    }
  }
}

void Chain::check_area(Batch& batch, const double* lon, const double* lat) const {
  for (const Area& area : areas_) {
    for (std::size_t i = 0; i < batch.count; ++i) {
      if (far_outside(area, lon[i], lat[i]) && batch.status[i] == TW_SUCCESS) {
        batch.status[i] = TW_RANGE_ERROR;
        batch.reason[i] = kFarReason;
      }
    }
  }
}

void Chain::check_areas(Batch& batch, bool before) const {
  if (areas_.empty()) return;
  if (before) {
    if (areas_before_) return check_area(batch, batch.x.data(), batch.y.data());
    if (!source_position_) return;
    std::vector<double> lon(batch.count), lat(batch.count);
    source_position_->forward(
        batch.count, Coordinates<const double>{batch.x.data(), batch.y.data(), batch.z.data()},
        Coordinates<double>{lon.data(), lat.data()});
    return check_area(batch, lon.data(), lat.data());
  }
  const bool told = areas_before_ || source_position_;
  if (!told && target_.kind() != Kind::plane && target_.kind() != Kind::space) {
    check_area(batch, batch.x.data(), batch.y.data());
  }
}

void Chain::run(Batch& batch) const {
  if (source_.by_zones()) run_zones(batch, true);
  check_areas(batch, true);
  // A geoid belongs to the datum of the heights above the ellipsoid: it is put on before the shift,
  // and taken off behind it.
  if (geoid_ && request_.geoid_to_ellipsoid) run_geoid(batch, source_position_, 1);
  if (whole_) {
    apply(*whole_, batch);
  } else {
    if (enter_) apply(*enter_, batch);
    if (!grids_.empty()) run_grids(batch);
    if (formulas_) run_formulas(batch);
    if (leave_) apply(*leave_, batch);
  }
  if (geoid_ && !request_.geoid_to_ellipsoid) run_geoid(batch, target_position_, -1);
  check_areas(batch, false);
  if (target_.by_zones()) run_zones(batch, false);
  for (std::size_t i = 0; i < batch.count; ++i) {
    const bool finite =
        std::isfinite(batch.x[i]) && std::isfinite(batch.y[i]) && std::isfinite(batch.z[i]);
    if (!finite && batch.status[i] == TW_SUCCESS) batch.status[i] = TW_RANGE_ERROR;
  }
}

std::string Chain::describe() const {
  std::string text = "from " + source_.name() + "\nto " + target_.name() + "\n";
  if (whole_) text += whole_->describe();
  for (const ShiftGrid& grid : grids_) text += "by " + grid.path() + ": " + grid.describe() + "\n";
  if (formulas_) text += "by " + request_.shift + "\n";
  if (geoid_) text += "heights by " + geoid_->path() + ": " + geoid_->describe() + "\n";
  return text;
}

}  // namespace tidewater::command
