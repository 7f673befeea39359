// References of the military grid: universal transverse Mercator and polar stereographic
// coordinates with letters for zones of latitude and for squares of 100 km.
//
// The Universal Grids and the Transverse Mercator and Polar Stereographic Map Projections,
// NGA.SIG.0012_2.0.0_UTMUPS (2014).

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <memory>

#include "angle_text.hpp"
#include "formulas/transverse_mercator.hpp"
#include "makers.hpp"
#include "number_text.hpp"

namespace tidewater {

namespace detail {

namespace {

constexpr double kDegree = kPi / 180;
constexpr double kSquare = 100'000;
constexpr double kRowCycle = 2'000'000;        // the row letters come again
constexpr double kFalseNorthing = 10'000'000;  // of southern zones
constexpr double kFalseEasting = 500'000;      // of zones
constexpr double kFalseOrigin = 2'000'000;     // of the polar grids, both axes
constexpr int kMostDigits = 11;

constexpr std::string_view kBands = "CDEFGHJKLMNPQRSTUVWX";
constexpr std::string_view kPolarBands = "ABYZ";
// Of a zone, by its number modulo three from zone 1.
constexpr std::string_view kColumns[] = {"ABCDEFGH", "JKLMNPQR", "STUVWXYZ"};
// From the equator in odd zones; in even ones they begin with F.
constexpr std::string_view kRows = "ABCDEFGHJKLMNPQRSTUV";
constexpr std::size_t kEvenShift = 5;
// Of the polar zones, from the easting and northing beside them.
constexpr std::string_view kPolarColumns[] = {"JKLPQRSTUXYZ", "ABCFGHJKLPQR", "RSTUXYZ", "ABCFGHJ"};
constexpr std::string_view kPolarRows[] = {"ABCDEFGHJKLMNPQRSTUVWXYZ", "ABCDEFGHJKLMNP"};
constexpr int kPolarFirst[] = {8, 20, 13, 20};  // columns, in squares
constexpr int kPolarFirstRow[] = {8, 13};       // south, north

constexpr double kA = 6378137;  // WGS 84
constexpr double kF = 1 / 298.257223563;

// Degrees from the central meridian and of latitude, to metres from where that meets the equator.
class TransverseMercatorGrid {
 public:
  TWstatus forward(double longitude, double latitude, double* easting, double* y) const {
    const auto at = map_.forward(longitude * kDegree, latitude * kDegree);
    *easting = kFalseEasting + at.x;
    *y = at.y;
    return at.plain ? TW_SUCCESS : TW_RANGE_ERROR;
  }
  TWstatus inverse(double easting, double y, double* longitude, double* latitude) const {
    const auto at = map_.inverse(easting - kFalseEasting, y);
    *longitude = at.lon / kDegree;
    *latitude = at.lat / kDegree;
    return at.plain ? TW_SUCCESS : TW_RANGE_ERROR;
  }

  static const TransverseMercatorGrid& shared() {
    static const TransverseMercatorGrid grid;
    return grid;
  }

 private:
  TransverseMercator map_{kA, kF, 0.9996};
};

// Degrees to metres and back about a pole.
class PolarGrid {
 public:
  explicit PolarGrid(bool north) {
    Definition definition;
    definition.parameters = {{kLat0, north ? kHalfPi : -kHalfPi},
                             {kK0, 0.994},
                             {kX0, kFalseOrigin},
                             {kY0, kFalseOrigin}};
    constexpr double e2 = kF * (2 - kF);
    formula_ = make_polar_stereographic_a({definition, kA, std::sqrt(e2), e2, kF});
  }

  TWstatus forward(double longitude, double latitude, double* easting, double* northing) const {
    CoordinateTriple point = {longitude * kDegree, latitude * kDegree, 0};
    const TWstatus word = formula_->forward(1, &point, &point);
    *easting = formula_->plane.x0 + formula_->plane.sx * point.x;
    *northing = formula_->plane.y0 + formula_->plane.sy * point.y;
    return word;
  }
  TWstatus inverse(double easting, double northing, double* longitude, double* latitude) const {
    CoordinateTriple point = {(easting - formula_->plane.x0) / formula_->plane.sx,
                              (northing - formula_->plane.y0) / formula_->plane.sy, 0};
    const TWstatus word = formula_->inverse(1, &point, &point);
    *longitude = point.x / kDegree;
    *latitude = point.y / kDegree;
    return word;
  }

  static const PolarGrid& shared(bool north) {
    static const PolarGrid grids[] = {PolarGrid(false), PolarGrid(true)};
    return grids[north];
  }

 private:
  Made formula_;
};

GridPosition refused(std::string reason) {
  GridPosition grid;
  grid.reason = std::move(reason);
  return grid;
}

// -180 up to but not 180.
double wrapped(double longitude) {
  longitude = std::remainder(longitude, 360);
  return longitude == 180 ? -180 : longitude;
}

double central_meridian(int zone) { return 6 * zone - 183; }

std::size_t band_of(double latitude) {
  const double band = std::floor((latitude + 80) / 8);
  // A hair south of the equator the sum is rounded up to it; the squares end there.
  return static_cast<std::size_t>(std::clamp(band, 0.0, latitude < 0 ? 9.0 : 19.0));
}

// West and east of a zone's cell in a band, from its central meridian, in degrees.  Norway and
// Svalbard have their own; zones 32, 34 and 36 have no cell in the last band.
struct Cell {
  double west = -3, east = 3;
};
Cell cell_of(int zone, std::size_t band) {
  const double lon0 = central_meridian(zone);
  const auto between = [lon0](double west, double east) { return Cell{west - lon0, east - lon0}; };
  if (kBands[band] == 'V' && zone == 31) return between(0, 3);
  if (kBands[band] == 'V' && zone == 32) return between(3, 12);
  if (kBands[band] == 'X' && zone == 31) return between(0, 9);
  if (kBands[band] == 'X' && zone == 33) return between(9, 21);
  if (kBands[band] == 'X' && zone == 35) return between(21, 33);
  if (kBands[band] == 'X' && zone == 37) return between(33, 42);
  if (kBands[band] == 'X' && (zone == 32 || zone == 34 || zone == 36)) return {0, 0};
  return {};
}

double latitude_of(double easting, double y) {
  double longitude = 0, latitude = 0;
  TransverseMercatorGrid::shared().inverse(easting, y, &longitude, &latitude);
  return latitude;
}

// Whether the square of 100 km touches the band; y counts from the equator.
bool touches_band(double easting, double y, std::size_t band) {
  const double south = -80 + 8 * static_cast<double>(band);
  const double north = kBands[band] == 'X' ? 84 : south + 8;
  // A square on the other side of the equator is mirrored.
  const bool mirrored = y < 0;
  const double bottom = mirrored ? -y - kSquare : y;
  const double low = mirrored ? -north : south;
  const double high = mirrored ? -south : north;
  // A degree of the meridian has 110.5 to 111.7 km, and away from the central meridian latitude
  // falls by 0.14 degrees at most: far from the band's ends that suffices.
  if ((bottom + kSquare) / 111'700 - 0.3 > low && bottom / 110'500 < high) return true;
  // Latitude falls away from the central meridian: lowest in the outer corner, highest on the top
  // edge at the inner end.
  const double outer =
      std::max(std::fabs(easting - kFalseEasting), std::fabs(easting + kSquare - kFalseEasting));
  const bool holds_meridian = easting <= kFalseEasting && easting + kSquare >= kFalseEasting;
  const double inner = holds_meridian ? 0
                                      : std::min(std::fabs(easting - kFalseEasting),
                                                 std::fabs(easting + kSquare - kFalseEasting));
  return latitude_of(kFalseEasting + inner, bottom + kSquare) > low &&
         latitude_of(kFalseEasting + outer, bottom) < high;
}

// Whether the square comes within 50 km of the zone's cell: neighbouring zones overlap by 40 km.
bool near_cell(double easting, double y, int zone, std::size_t band) {
  constexpr double kOverlap = 50'000;
  const Cell cell = cell_of(zone, band);
  // Roughly, to 15 km, and with 30 km of margin.
  const double degree = 111'300 * std::cos(std::fabs(y + kSquare / 2) / 111'100 * kDegree);
  const double middle = easting + kSquare / 2 - kFalseEasting;
  constexpr double kSure = kSquare / 2 + kOverlap - 30'000;
  if (middle > cell.west * degree - kSure && middle < cell.east * degree + kSure) return true;
  // The widest place of the square is that nearest to the equator, within the band.
  const double nearest = y < 0 ? std::min(0.0, y + kSquare) : y;
  const double lat = std::clamp(latitude_of(kFalseEasting, nearest), -80.0, 84.0);
  double west = 0, east = 0, unused = 0;
  TransverseMercatorGrid::shared().forward(cell.west, lat, &west, &unused);
  TransverseMercatorGrid::shared().forward(cell.east, lat, &east, &unused);
  return easting + kSquare > west - kOverlap && easting < east + kOverlap;
}

GridPosition parse_utm(std::string_view text, int zone, char band_letter, std::string_view square) {
  const std::size_t band = kBands.find(band_letter);
  if (band == kBands.npos) {
    return refused(quoted(text) + " has the band " + band_letter +
                   "; the bands of zones are C to X without I and O.");
  }
  if (cell_of(zone, band).west == cell_of(zone, band).east) {
    return refused(quoted(text) + " has zone " + std::to_string(zone) +
                   ", which has no part in band X; Svalbard is in zones 31, 33, 35 and 37.");
  }
  const std::string_view columns = kColumns[(zone - 1) % 3];
  const std::size_t column = columns.find(square[0]);
  if (column == columns.npos) {
    return refused(quoted(text) + " has the column " + square[0] + "; the columns of zone " +
                   std::to_string(zone) + " are " + columns.front() + " to " + columns.back() +
                   " without I and O.");
  }
  std::size_t row = kRows.find(square[1]);
  if (row == kRows.npos) {
    return refused(quoted(text) + " has the row " + square[1] +
                   "; the rows are A to V without I and O.");
  }
  if (zone % 2 == 0) row = (row + kRows.size() - kEvenShift) % kRows.size();

  const bool north = band_letter >= 'N';
  const double easting = kSquare * static_cast<double>(column + 1);
  // Of the rows with this letter the one nearest to the middle of the band.
  const double middle_latitude = band_letter == 'X' ? 78 : -76 + 8 * static_cast<double>(band);
  const double middle = middle_latitude * 111'000 - kSquare / 2;
  const double from_equator = kSquare * static_cast<double>(row);
  const double y = from_equator + kRowCycle * std::round((middle - from_equator) / kRowCycle);
  if (!touches_band(easting, y, band)) {
    return refused(quoted(text) + " names a square that does not lie in band " + band_letter + ".");
  }
  if (!near_cell(easting, y, zone, band)) {
    return refused(quoted(text) + " names a square that does not lie in zone " +
                   std::to_string(zone) + ".");
  }
  GridPosition grid;
  grid.zone = zone;
  grid.north = north;
  grid.easting = easting;
  grid.northing = north ? y : y + kFalseNorthing;
  return grid;
}

GridPosition parse_polar(std::string_view text, char band_letter, std::string_view square) {
  const std::size_t band = kPolarBands.find(band_letter);
  if (band == kPolarBands.npos) {
    return refused(quoted(text) + " has no zone number, and " + band_letter +
                   " is none of the polar bands A, B, Y and Z.");
  }
  const bool north = band >= 2;
  const std::size_t column = kPolarColumns[band].find(square[0]);
  const std::size_t row = kPolarRows[north].find(square[1]);
  if (column == std::string_view::npos) {
    return refused(quoted(text) + " has the column " + square[0] + "; the columns of band " +
                   band_letter + " are " + std::string(kPolarColumns[band]) + ".");
  }
  if (row == std::string_view::npos) {
    return refused(quoted(text) + " has the row " + square[1] + "; the rows of band " +
                   band_letter + " are " + kPolarRows[north].front() + " to " +
                   kPolarRows[north].back() + " without I and O.");
  }
  GridPosition grid;
  grid.zone = 0;
  grid.north = north;
  grid.easting = kSquare * (kPolarFirst[band] + static_cast<double>(column));
  grid.northing = kSquare * (kPolarFirstRow[north] + static_cast<double>(row));
  // The corner that is nearest to the pole; the polar zones end at 84 degrees north and 80 south,
  // half a degree is the overlap.
  const double x = std::clamp(kFalseOrigin, grid.easting, grid.easting + kSquare);
  const double y = std::clamp(kFalseOrigin, grid.northing, grid.northing + kSquare);
  double longitude = 0, latitude = 0;
  PolarGrid::shared(north).inverse(x, y, &longitude, &latitude);
  const double limit = north ? 83.5 : 79.5;
  if (std::fabs(latitude) < limit) {
    return refused(quoted(text) + " names a square that does not lie in the polar zone.");
  }
  return grid;
}

}  // namespace

}  // namespace detail

using namespace detail;

int utm_zone(double longitude, double latitude) {
  if (!std::isfinite(longitude) || !(std::fabs(latitude) <= 90)) return -1;
  if (latitude >= 84 || latitude < -80) return 0;
  longitude = wrapped(longitude);
  const std::size_t band = band_of(latitude);
  // Just short of 180 degrees the sum is rounded up.
  const int zone = std::min(static_cast<int>(std::floor((longitude + 180) / 6)) + 1, 60);
  // The wider zones of Norway and Svalbard take from their neighbours.
  for (const int own : {zone, zone - 1}) {
    const Cell cell = cell_of(own, band);
    const double from = longitude - central_meridian(own);
    if (cell.west <= from && from < cell.east) return own;
  }
  return zone + 1;
}

GridPosition grid_position(double longitude, double latitude, int zone) {
  if (!std::isfinite(longitude) || !(std::fabs(latitude) <= 90)) {
    return refused("A grid position needs a longitude and a latitude of at most 90 degrees.");
  }
  if (zone < -1 || zone > 60) {
    return refused("There is no zone " + std::to_string(zone) +
                   "; zones are 1 to 60, and 0 at the poles.");
  }
  GridPosition grid;
  grid.zone = zone == -1 ? utm_zone(longitude, latitude) : zone;
  grid.north = latitude >= 0;
  double x = 0, y = 0;
  TWstatus word = TW_SUCCESS;
  if (grid.zone == 0) {
    word = PolarGrid::shared(grid.north).forward(wrapped(longitude), latitude, &x, &y);
  } else {
    const double from = std::remainder(longitude - central_meridian(grid.zone), 360);
    word = TransverseMercatorGrid::shared().forward(from, latitude, &x, &y);
    if (!grid.north) y += kFalseNorthing;
  }
  if (word != TW_SUCCESS) {
    return refused("The point is too far from zone " + std::to_string(grid.zone) + ".");
  }
  grid.easting = x;
  grid.northing = y;
  return grid;
}

ParsedPosition position_of(const GridPosition& grid) {
  ParsedPosition position;
  const double x = grid.easting + grid.square / 2;
  const double y = grid.northing + grid.square / 2;
  double longitude = 0, latitude = 0, lon0 = 0;
  TWstatus word = TW_SUCCESS;
  if (grid.zone == 0) {
    word = PolarGrid::shared(grid.north).inverse(x, y, &longitude, &latitude);
  } else if (grid.zone >= 1 && grid.zone <= 60) {
    word = TransverseMercatorGrid::shared().inverse(x, grid.north ? y : y - kFalseNorthing,
                                                    &longitude, &latitude);
    lon0 = central_meridian(grid.zone);
  } else {
    position.reason = "There is no zone " + std::to_string(grid.zone) +
                      "; zones are 1 to 60, and 0 at the poles.";
    return position;
  }
  if (word != TW_SUCCESS || !std::isfinite(x) || !std::isfinite(y)) {
    position.reason = "The grid has no point at these coordinates.";
    return position;
  }
  position.longitude = std::remainder(longitude + lon0, 360);
  position.latitude = latitude;
  return position;
}

GridPosition parse_mgrs(std::string_view text) {
  // Zone, band, column, row and digits, with blanks anywhere between the groups.
  std::string figures, letters, digits;
  std::size_t groups = 0, first_group = 0;
  bool blank = true;
  for (const char c : text) {
    const char upper = c >= 'a' && c <= 'z' ? static_cast<char>(c - 32) : c;
    if (c == ' ' || c == '\t' || c == '\r' || c == '\n') {
      blank = true;
    } else if (is_digit(c) && letters.empty() && figures.size() < 3) {
      figures += c;
      blank = false;
    } else if (upper >= 'A' && upper <= 'Z' && digits.empty() && letters.size() < 3) {
      letters += upper;
      blank = true;  // the digits may follow at once
    } else if (is_digit(c) && letters.size() == 3) {
      if (blank) ++groups;
      if (groups == 1) ++first_group;
      digits += c;
      blank = false;
    } else {
      return refused(quoted(text) +
                     " is no grid reference: a zone, three letters and pairs of digits.");
    }
  }
  if (letters.size() != 3 || figures.size() > 2) {
    return refused(quoted(text) +
                   " is no grid reference: a zone, three letters and pairs of digits.");
  }
  if (groups > 2 || (groups == 2 && first_group * 2 != digits.size())) {
    return refused(quoted(text) +
                   " has groups of digits of unequal length; easting and northing need the same.");
  }
  if (digits.size() > 2 * kMostDigits) {
    return refused(quoted(text) + " has more than 11 digits each of easting and northing.");
  }
  if (digits.size() % 2 != 0) {
    return refused(quoted(text) +
                   " has an odd number of digits; easting and northing need the "
                   "same.");
  }
  int zone = 0;
  for (const char c : figures) zone = zone * 10 + (c - '0');
  if (!figures.empty() && (zone < 1 || zone > 60)) {
    return refused(quoted(text) + " has the zone " + figures + "; zones are 1 to 60.");
  }
  GridPosition grid = figures.empty() ? parse_polar(text, letters[0], {&letters[1], 2})
                                      : parse_utm(text, zone, letters[0], {&letters[1], 2});
  if (!grid) return grid;
  const std::size_t half = digits.size() / 2;
  const double unit = half <= 5 ? kPowersOfTen[5 - half] : 1 / kPowersOfTen[half - 5];
  const auto metres = [&](const char* begin) {
    const double units = read_digits(begin, begin + half).value;
    return half <= 5 ? units * unit : units / kPowersOfTen[half - 5];
  };
  if (half > 0) {
    grid.easting += metres(digits.data());
    grid.northing += metres(digits.data() + half);
  }
  grid.square = unit;
  return grid;
}

namespace {

// The latitude decides on the band.
std::string mgrs_text(const GridPosition& grid, double latitude, int digits, bool blanks) {
  digits = std::clamp(digits, 0, kMostDigits);
  // A point a hair south of the equator is not in the square north of it.
  double northing = grid.northing;
  if (grid.zone != 0 && !grid.north && latitude < 0 && northing >= kFalseNorthing) {
    northing = std::nextafter(kFalseNorthing, 0);
  }
  const double column = std::floor(grid.easting / kSquare);
  const double row = std::floor(northing / kSquare);
  std::string text;
  if (grid.zone == 0) {
    const std::size_t band = (grid.north ? 2u : 0u) + (grid.easting >= kFalseOrigin ? 1u : 0u);
    const double c = column - kPolarFirst[band];
    const double r = row - kPolarFirstRow[grid.north];
    if (!(c >= 0 && c < static_cast<double>(kPolarColumns[band].size()) && r >= 0 &&
          r < static_cast<double>(kPolarRows[grid.north].size()))) {
      return {};
    }
    text += kPolarBands[band];
    if (blanks) text += ' ';
    text += kPolarColumns[band][static_cast<std::size_t>(c)];
    text += kPolarRows[grid.north][static_cast<std::size_t>(r)];
  } else {
    if (!(column >= 1 && column <= 8 && latitude >= -80.5 && latitude <= 84.5)) return {};
    text += static_cast<char>('0' + grid.zone / 10);
    text += static_cast<char>('0' + grid.zone % 10);
    text += kBands[band_of(latitude)];
    if (blanks) text += ' ';
    text += kColumns[(grid.zone - 1) % 3][static_cast<std::size_t>(column - 1)];
    // The false northing is five cycles of the rows; a northing may also be below zero.
    auto letter = static_cast<std::size_t>(std::fmod(row + 200, 20));
    if (grid.zone % 2 == 0) letter += kEvenShift;
    text += kRows[letter % kRows.size()];
  }
  if (digits == 0) return text;
  for (const double within : {grid.easting - column * kSquare, northing - row * kSquare}) {
    if (blanks) text += ' ';
    const double scaled =
        digits <= 5 ? within / kPowersOfTen[5 - digits] : within * kPowersOfTen[digits - 5];
    // The product may have been rounded up to the next square.
    const auto units = std::min(static_cast<std::uint64_t>(scaled),
                                static_cast<std::uint64_t>(kPowersOfTen[digits]) - 1);
    const std::string figures = std::to_string(units);
    text.append(static_cast<std::size_t>(digits) - figures.size(), '0');
    text += figures;
  }
  return text;
}

}  // namespace

std::string format_mgrs(const GridPosition& grid, int digits, bool blanks) {
  GridPosition corner = grid;
  corner.square = 0;
  const ParsedPosition position = position_of(corner);
  if (!position) return {};
  return mgrs_text(corner, position.latitude, digits, blanks);
}

std::string format_mgrs(double longitude, double latitude, int digits, bool blanks) {
  const GridPosition grid = grid_position(longitude, latitude);
  if (!grid) return {};
  return mgrs_text(grid, latitude, digits, blanks);
}

}  // namespace tidewater
