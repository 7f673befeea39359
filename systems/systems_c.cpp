// The C interface: handles around the objects, errors as sentences.
#include <algorithm>
#include <cstring>
#include <exception>
#include <new>
#include <string>
#include <variant>

#include "tidewater/lines.hpp"
#include "tidewater/magnetic_model.hpp"
#include "tidewater/position_text.hpp"
#include "tidewater/systems.h"
#include "tidewater/transformation.hpp"
#include "tidewater/version.h"

using tidewater::Candidate;
using tidewater::Coordinates;
using tidewater::Projection;
using tidewater::System;
using tidewater::Transformation;
using tidewater::TransformationOptions;

struct tw_system {
  System value;
};
struct tw_transformation {
  Transformation value;
};
struct tw_projection {
  Projection value;
};
struct tw_magnetic_model {
  tidewater::MagneticModel value;
};
struct tw_lines {
  std::variant<tidewater::Geodesic, tidewater::Rhumb> value;
};
struct tw_candidates {
  std::vector<Candidate> value;
};

namespace {

// A fixed place, so that a failure to get memory has its sentence too.
thread_local char last_error[2048] = "";

void remember(const char* sentence) noexcept {
  const std::size_t size = std::min(std::strlen(sentence), sizeof last_error - 1);
  std::memcpy(last_error, sentence, size);
  last_error[size] = 0;
}

// What `make` gives, or the given value with the reason remembered.
template <class Make, class Otherwise>
auto guarded(const Make& make, Otherwise otherwise) noexcept -> decltype(make()) {
  try {
    return make();
  } catch (const std::bad_alloc&) {
    remember("There is not enough memory.");
  } catch (const std::exception& error) {
    remember(error.what());
  }
  return otherwise;
}

std::size_t copied(const std::string& from, char* text, std::size_t size) noexcept {
  if (text != nullptr && size > 0) {
    const std::size_t fits = std::min(from.size(), size - 1);
    std::memcpy(text, from.data(), fits);
    text[fits] = 0;
  }
  return from.size();
}

// A text that `make` gives, copied; empty where it fails.
template <class Make>
std::size_t text_of(const Make& make, char* text, std::size_t size) noexcept {
  if (text != nullptr && size > 0) *text = 0;
  return guarded([&] { return copied(make(), text, size); }, std::size_t{0});
}

std::string_view given(const char* text) {
  if (text == nullptr) throw tidewater::Error("A text that is needed was null.");
  return text;
}

template <class T>
const T& given(const T* handle) {
  if (handle == nullptr) throw tidewater::Error("A handle that is needed was null.");
  return *handle;
}

// One of the three values that axes and orders have.
template <class Choice>
Choice given(std::int32_t choice) {
  if (choice < 0 || choice > 2) throw tidewater::Error("An axis or order is none of 0, 1 and 2.");
  return static_cast<Choice>(choice);
}

TransformationOptions options_from(const tw_transformation_options* from) {
  TransformationOptions options;
  if (from == nullptr) return options;
  if (from->operation != nullptr) options.operation = from->operation;
  if (from->grid_folders != nullptr) {
    std::string_view rest = from->grid_folders;
    while (!rest.empty()) {
      const auto end = std::min(rest.find('\n'), rest.size());
      if (end > 0) options.grid_folders.emplace_back(rest.substr(0, end));
      rest.remove_prefix(std::min(end + 1, rest.size()));
    }
  }
  if (from->epoch != 0) options.epoch = from->epoch;
  if (from->area != nullptr) {
    options.area = tidewater::Area{"", from->area[0], from->area[1], from->area[2], from->area[3]};
  }
  options.radians = from->radians != 0;
  options.own_axes = from->own_axes != 0;
  return options;
}

template <class T>
Coordinates<const T> read_view(const T* x, const T* y, const T* z, std::ptrdiff_t stride) {
  return {x, y, z, stride};
}

template <class T>
Coordinates<T> written_view(T* x, T* y, T* z, std::ptrdiff_t stride) {
  return {x, y, z, stride};
}

// Every point fails where an argument that is needed is null.
std::size_t all_fail(std::size_t count, TWstatus* status) {
  if (status != nullptr) std::fill_n(status, count, TW_BAD_INPUT);
  return count;
}

template <class Points, class Object>
std::size_t run(const Object* object, std::int32_t inverse, std::size_t count, const Points* in,
                const Points* out, TWstatus* status, std::uint32_t threads) {
  if (count == 0) return 0;
  if (object == nullptr || in == nullptr || out == nullptr || in->x == nullptr ||
      in->y == nullptr || out->x == nullptr || out->y == nullptr) {
    return all_fail(count, status);
  }
  const auto from = read_view(in->x, in->y, in->z, in->stride);
  const auto to = written_view(out->x, out->y, out->z, out->stride);
  const tidewater::Run how = {status, threads};
  return (inverse != 0 ? object->value.inverse(count, from, to, how)
                       : object->value.forward(count, from, to, how))
      .failed;
}

}  // namespace

const char* tw_version(void) { return TIDEWATER_VERSION; }

const char* tw_last_error(void) { return last_error; }

const char* tw_status_text(TWstatus status) {
  struct Text {
    TWstatus status;
    const char* text;
  };
  static constexpr Text kTexts[] = {
      {TW_SUCCESS, "The point was computed."},
      {TW_FAILURE, "A step failed."},
      {TW_RANGE_ERROR, "The formula has no answer for the point."},
      {TW_BAD_ECCENTRICITY, "The eccentricity is one or more, or negative."},
      {TW_BAD_LONGITUDE, "The longitude is out of range."},
      {TW_BAD_LATITUDE, "The latitude is out of range."},
      {TW_BAD_SCALE_LATITUDE, "The scale is not above 0 and at most 1."},
      {TW_BAD_DATE, "The date is outside the magnetic model's span."},
      {TW_BAD_STANDARD_PARALLEL, "The standard parallel is at the pole."},
      {TW_BAD_SEMI_MAJOR, "The semi-major axis is zero or below."},
      {TW_DIVERGED, "The iteration ran away: the point is too far from the map's centre."},
      {TW_BAD_ZONE, "There is no such zone."},
      {TW_BAD_HEMISPHERE, "There is no such hemisphere."},
      {TW_BAD_TEXT, "The text has a character that does not fit."},
      {TW_BAD_INPUT, "The input is no finite number, or outside its values."},
      {TW_NOT_CONVERGED, "The point is outside the formula's domain, or its iteration ran out."},
      {TW_NO_MEMORY, "There is not enough memory."},
      {TW_BAD_DATA, "Values read or worked out are unusable."},
      {TW_BAD_PARAMETER, "The parameters do not fit together."},
      {TW_SINGULAR, "The scale factor is zero."},
      {TW_NO_SUCH_MODEL, "The store has no such model."},
      {TW_BAD_HARMONIC_MODEL, "The harmonic model's data cannot be used."},
      {TW_GEOID_FILE_ERROR, "The list of geoid grids cannot be used."},
      {TW_GRID_FILE_ERROR, "A shift grid cannot be used."},
      {TW_BAD_TOLERANCE, "The tolerance is zero."},
      {TW_NO_SUCH_SYSTEM, "The store has no such system."},
      {TW_PF_OPEN_ERROR, "The parameter store cannot be opened."},
      {TW_PF_TABLE_ERROR, "A table of the store cannot be read."},
      {TW_NO_SUCH_VERT_DATUM, "The store has no such vertical datum."},
      {TW_BUFFER_TOO_SMALL, "Fewer than two points were asked for."},
      {TW_GEOID_READ_ERROR, "A geoid file cannot be read."},
      {TW_GSB_READ_ERROR, "A national grid file cannot be read."},
      {TW_GRID_NOT_FOUND, "The list of grids cannot be opened, or is empty."},
      {TW_NO_SUCH_SATELLITE, "The store has no such satellite."},
      {TW_W_NO_POINTS, "The line is too short for any point between."},
      {TW_I_LATITUDE_LIMITED, "A value was held at its limit, or an iteration ran out."},
      {TW_I_OUTSIDE_NADCON, "The point is outside the grid."},
      {TW_I_OUTSIDE_GEOID, "The point is outside the geoid grid."},
      {TW_I_OUTSIDE_CNT, "The point is outside the grid."},
  };
  for (const Text& entry : kTexts) {
    if (entry.status == status) return entry.text;
  }
  return "There is no such status word.";
}

tw_system* tw_system_create(const char* text) {
  return guarded([&] { return new tw_system{System(given(text))}; }, nullptr);
}

tw_system* tw_system_create_at(const char* text, double longitude, double latitude) {
  return guarded([&] { return new tw_system{System(given(text), longitude, latitude)}; }, nullptr);
}

void tw_system_destroy(tw_system* system) { delete system; }

int32_t tw_system_code(const tw_system* system) {
  return system == nullptr ? 0 : system->value.code();
}

tw_kind tw_system_kind(const tw_system* system) {
  return system == nullptr ? TW_GEOGRAPHIC_2D : static_cast<tw_kind>(system->value.kind());
}

double tw_system_unit_factor(const tw_system* system) {
  return system == nullptr ? 0 : system->value.unit_factor();
}

size_t tw_system_name(const tw_system* system, char* text, size_t size) {
  return text_of([&] { return given(system).value.name(); }, text, size);
}

size_t tw_system_datum(const tw_system* system, char* text, size_t size) {
  return text_of([&] { return given(system).value.datum(); }, text, size);
}

size_t tw_system_method(const tw_system* system, char* text, size_t size) {
  return text_of([&] { return given(system).value.method(); }, text, size);
}

size_t tw_system_unit(const tw_system* system, char* text, size_t size) {
  return text_of([&] { return given(system).value.unit(); }, text, size);
}

size_t tw_system_axes(const tw_system* system, char* text, size_t size) {
  return text_of([&] { return given(system).value.axes(); }, text, size);
}

size_t tw_system_describe(const tw_system* system, char* text, size_t size) {
  return text_of([&] { return given(system).value.describe(); }, text, size);
}

size_t tw_system_text(const tw_system* system, const char* form, char* text, size_t size) {
  return text_of(
      [&] {
        const std::string_view wanted = given(form);
        if (wanted == "proj") return given(system).value.to_proj();
        return given(system).value.to_wkt(wanted);
      },
      text, size);
}

int32_t tw_system_area(const tw_system* system, double bounds[4]) {
  return guarded(
      [&]() -> int32_t {
        const tidewater::Area area = given(system).value.area();
        bounds[0] = area.west;
        bounds[1] = area.south;
        bounds[2] = area.east;
        bounds[3] = area.north;
        return area.name.empty() ? 0 : 1;
      },
      0);
}

size_t tw_system_search(const char* words, int32_t* codes, size_t limit) {
  return guarded(
      [&] {
        const auto found = System::search(given(words), limit);
        for (std::size_t i = 0; i < found.size(); ++i) codes[i] = found[i].code;
        return found.size();
      },
      std::size_t{0});
}

tw_transformation* tw_transformation_create(const tw_system* source, const tw_system* target,
                                            const tw_transformation_options* options) {
  return guarded(
      [&] {
        return new tw_transformation{
            Transformation(given(source).value, given(target).value, options_from(options))};
      },
      nullptr);
}

void tw_transformation_destroy(tw_transformation* transformation) { delete transformation; }

size_t tw_transform(const tw_transformation* transformation, int32_t inverse, size_t count,
                    const tw_points* in, const tw_points* out, TWstatus* status, uint32_t threads) {
  return run(transformation, inverse, count, in, out, status, threads);
}

size_t tw_transform_f(const tw_transformation* transformation, int32_t inverse, size_t count,
                      const tw_points_f* in, const tw_points_f* out, TWstatus* status,
                      uint32_t threads) {
  return run(transformation, inverse, count, in, out, status, threads);
}

size_t tw_transformation_describe(const tw_transformation* transformation, char* text,
                                  size_t size) {
  return text_of([&] { return given(transformation).value.describe(); }, text, size);
}

size_t tw_transformation_operation(const tw_transformation* transformation, char* text,
                                   size_t size) {
  return text_of([&] { return given(transformation).value.operation(); }, text, size);
}

double tw_transformation_accuracy(const tw_transformation* transformation) {
  return transformation == nullptr ? std::numeric_limits<double>::quiet_NaN()
                                   : transformation->value.accuracy();
}

tw_candidates* tw_candidates_create(const tw_system* source, const tw_system* target,
                                    const tw_transformation_options* options) {
  return guarded(
      [&] {
        return new tw_candidates{Transformation::candidates(
            given(source).value, given(target).value, options_from(options))};
      },
      nullptr);
}

void tw_candidates_destroy(tw_candidates* candidates) { delete candidates; }

size_t tw_candidates_count(const tw_candidates* candidates) {
  return candidates == nullptr ? 0 : candidates->value.size();
}

size_t tw_candidate_operation(const tw_candidates* candidates, size_t i, char* text, size_t size) {
  return text_of([&] { return given(candidates).value.at(i).steps; }, text, size);
}

size_t tw_candidate_name(const tw_candidates* candidates, size_t i, char* text, size_t size) {
  return text_of([&] { return given(candidates).value.at(i).name; }, text, size);
}

double tw_candidate_accuracy(const tw_candidates* candidates, size_t i) {
  return candidates == nullptr || i >= candidates->value.size()
             ? std::numeric_limits<double>::quiet_NaN()
             : candidates->value[i].accuracy;
}

size_t tw_candidate_missing(const tw_candidates* candidates, size_t i, char* text, size_t size) {
  return text_of([&] { return given(candidates).value.at(i).missing; }, text, size);
}

tw_projection* tw_projection_create(const char* method, size_t count, const char* const* names,
                                    const double* values, double a, double inverse_flattening) {
  return guarded(
      [&] {
        std::vector<std::pair<std::string, double>> parameters;
        for (std::size_t i = 0; i < count; ++i) parameters.emplace_back(given(names[i]), values[i]);
        return new tw_projection{
            Projection(given(method), parameters, tidewater::Ellipsoid(a, inverse_flattening))};
      },
      nullptr);
}

tw_projection* tw_projection_of(const tw_system* system) {
  return guarded(
      [&] {
        auto projection = given(system).value.projection();
        if (!projection) throw tidewater::Error("The system is not projected.");
        return new tw_projection{*std::move(projection)};
      },
      nullptr);
}

void tw_projection_destroy(tw_projection* projection) { delete projection; }

size_t tw_project(const tw_projection* projection, int32_t inverse, size_t count,
                  const tw_points* in, const tw_points* out, TWstatus* status, uint32_t threads) {
  return run(projection, inverse, count, in, out, status, threads);
}

size_t tw_project_factors(const tw_projection* projection, size_t count, const tw_points* in,
                          tw_factors* out, TWstatus* status) {
  if (count == 0) return 0;
  if (projection == nullptr || in == nullptr || out == nullptr || in->x == nullptr ||
      in->y == nullptr) {
    return all_fail(count, status);
  }
  constexpr std::size_t kAtOnce = 64;
  std::size_t failed = 0;
  for (std::size_t begin = 0; begin < count; begin += kAtOnce) {
    tidewater::Factors some[kAtOnce];
    const std::size_t points = std::min(kAtOnce, count - begin);
    const auto first = static_cast<std::ptrdiff_t>(begin) * in->stride;
    const Coordinates<const double> from = {in->x + first, in->y + first, nullptr, in->stride};
    TWstatus* words = status == nullptr ? nullptr : status + begin;
    failed += projection->value.factors(points, from, some, {words}).failed;
    for (std::size_t i = 0; i < points; ++i) {
      out[begin + i] = {some[i].meridional, some[i].parallel, some[i].areal, some[i].convergence,
                        some[i].angular};
    }
  }
  return failed;
}

size_t tw_projection_method_count(void) {
  return guarded([] { return Projection::methods().size(); }, std::size_t{0});
}

size_t tw_projection_method(size_t i, char* text, size_t size) {
  return text_of([&] { return Projection::methods().at(i); }, text, size);
}

int32_t tw_parse_angle(const char* text, int32_t axis, int32_t decimal_comma, double* degrees) {
  return guarded(
      [&]() -> int32_t {
        const auto parsed =
            tidewater::parse_angle(given(text), given<tidewater::Axis>(axis), decimal_comma != 0);
        if (!parsed) throw tidewater::Error(parsed.reason);
        *degrees = parsed.degrees;
        return 1;
      },
      0);
}

int32_t tw_parse_position(const char* text, int32_t order, int32_t decimal_comma,
                          double position[3]) {
  return guarded(
      [&]() -> int32_t {
        const auto parsed = tidewater::parse_position(given(text), given<tidewater::Order>(order),
                                                      decimal_comma != 0);
        if (!parsed) throw tidewater::Error(parsed.reason);
        position[0] = parsed.longitude;
        position[1] = parsed.latitude;
        position[2] = parsed.height;
        return 1;
      },
      0);
}

int32_t tw_parse_mgrs(const char* text, double position[2]) {
  return guarded(
      [&]() -> int32_t {
        const auto grid = tidewater::parse_mgrs(given(text));
        if (!grid) throw tidewater::Error(grid.reason);
        const auto place = tidewater::position_of(grid);  // every square has a centre
        position[0] = place.longitude;
        position[1] = place.latitude;
        return 1;
      },
      0);
}

size_t tw_format_mgrs(double longitude, double latitude, int32_t digits, char* text, size_t size) {
  return text_of([&] { return tidewater::format_mgrs(longitude, latitude, digits); }, text, size);
}

tw_lines* tw_lines_create(int32_t rhumb, double a, double f) {
  return guarded(
      [&] {
        return rhumb != 0 ? new tw_lines{tidewater::Rhumb(a, f)}
                          : new tw_lines{tidewater::Geodesic(a, f)};
      },
      nullptr);
}

void tw_lines_destroy(tw_lines* lines) { delete lines; }

size_t tw_lines_direct(const tw_lines* lines, size_t count, const double* lon, const double* lat,
                       const double* azimuth, const double* length, double* end_lon,
                       double* end_lat, double* end_azimuth) {
  if (lines == nullptr) return count;
  return std::visit(
             [&](const auto& kind) {
               return kind.direct(count, {lon, lat, azimuth, length},
                                  {end_lon, end_lat, end_azimuth, nullptr});
             },
             lines->value)
      .failed;
}

size_t tw_lines_inverse(const tw_lines* lines, size_t count, const double* lon1, const double* lat1,
                        const double* lon2, const double* lat2, double* length, double* azimuth1,
                        double* azimuth2) {
  if (lines == nullptr) return count;
  return std::visit(
             [&](const auto& kind) {
               return kind.inverse(count, {lon1, lat1, lon2, lat2},
                                   {length, azimuth1, azimuth2, nullptr});
             },
             lines->value)
      .failed;
}

void tw_lines_polygon(const tw_lines* lines, size_t count, const double* lon, const double* lat,
                      double* perimeter, double* area) {
  const double none = std::numeric_limits<double>::quiet_NaN();
  tidewater::PolygonMeasure measure = {none, none};
  if (lines != nullptr) {
    measure = guarded(
        [&] {
          return std::visit([&](const auto& kind) { return kind.polygon(count, lon, lat); },
                            lines->value);
        },
        measure);
  }
  if (perimeter != nullptr) *perimeter = measure.perimeter;
  if (area != nullptr) *area = measure.area;
}

tw_magnetic_model* tw_magnetic_model_create(const char* name, double year) {
  return guarded(
      [&] {
        return new tw_magnetic_model{tidewater::MagneticModel(name == nullptr ? "" : name, year)};
      },
      nullptr);
}

void tw_magnetic_model_destroy(tw_magnetic_model* model) { delete model; }

size_t tw_magnetic_model_name(const tw_magnetic_model* model, char* text, size_t size) {
  return text_of([&] { return given(model).value.name(); }, text, size);
}

size_t tw_magnetic_field(const tw_magnetic_model* model, size_t count, const tw_points* in,
                         tw_magnetic_value* out, TWstatus* status) {
  if (count == 0) return 0;
  if (model == nullptr || in == nullptr || out == nullptr || in->x == nullptr || in->y == nullptr) {
    return all_fail(count, status);
  }
  constexpr std::size_t kAtOnce = 64;
  std::size_t failed = 0;
  for (std::size_t begin = 0; begin < count; begin += kAtOnce) {
    tidewater::MagneticValue some[kAtOnce];
    const std::size_t points = std::min(kAtOnce, count - begin);
    const auto first = static_cast<std::ptrdiff_t>(begin) * in->stride;
    const Coordinates<const double> from = {in->x + first, in->y + first,
                                            in->z == nullptr ? nullptr : in->z + first, in->stride};
    TWstatus* words = status == nullptr ? nullptr : status + begin;
    failed += model->value.field(points, from, some, {words}).failed;
    for (std::size_t i = 0; i < points; ++i) {
      const auto& f = some[i].field;
      const auto& y = some[i].yearly;
      out[begin + i] = {f.north,       f.east,        f.down,        f.horizontal, f.total,
                        f.declination, f.inclination, y.north,       y.east,       y.down,
                        y.horizontal,  y.total,       y.declination, y.inclination};
    }
  }
  return failed;
}
