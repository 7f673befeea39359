// Definitions from what users type: codes, short names, names of the registry, definitions in one
// line.
#include <algorithm>
#include <charconv>
#include <cmath>

#include "makers.hpp"
#include "registry.hpp"
#include "registry_names.hpp"
#include "system_impl.hpp"
#include "text_forms.hpp"
#include "text_forms_parts.hpp"
#include "tidewater/conformal.h"
#include "tidewater/ellipsoid.hpp"
#include "tidewater/position_text.hpp"
#include "words.hpp"

namespace tidewater::detail {

namespace {

constexpr double kDegree = kPi / 180;
constexpr double kUsSurveyFoot = 1200.0 / 3937;

std::string quoted(std::string_view text) { return "\"" + std::string(text) + "\""; }

// The first word up to a colon or blank in small letters, and what follows.
struct Headed {
  std::string head;
  std::string_view rest;
};
Headed headed(std::string_view text) {
  const auto end = std::min(text.find_first_of(": \t"), text.size());
  Headed result{folded(text.substr(0, end)), text.substr(end)};
  if (result.rest.starts_with(':')) result.rest.remove_prefix(1);
  result.rest = trimmed(result.rest);
  return result;
}

Definition geographic_named(std::string_view name) {
  Definition base = definition_from_text(name, std::nullopt);
  if (base.kind == SystemKind::projected && base.base_code != 0) {
    base = definition_from_registry(base.base_code);
  }
  if (base.kind != SystemKind::geographic2d && base.kind != SystemKind::geographic3d &&
      base.kind != SystemKind::geocentric) {
    throw Error(quoted(name) + " is not a geographic system.");
  }
  return base;
}

Definition projected_on(const Definition& base, std::string name, int method,
                        std::vector<ParameterValue> parameters) {
  Definition result;
  result.name = std::move(name);
  result.kind = SystemKind::projected;
  result.datum = base.datum;
  result.base = base.name;
  result.base_code = base.code;
  result.method = method;
  result.parameters = std::move(parameters);
  result.unit = {"metre", 9001, 1};
  result.axes = "EN";
  return result;
}

// The universal zone of the point that comes with a name.
int zone_at(const Where& where, std::string_view text) {
  const int zone = utm_zone(where.longitude, where.latitude);
  if (zone < 0) {
    throw Error("The point that should tell the zone of " + quoted(text) + " is not on the earth.");
  }
  return zone;
}

Definition utm(std::string_view rest, const std::optional<Where>& where, std::string_view text) {
  int zone = 0;
  bool south = false;
  const auto [end, error] = std::from_chars(rest.data(), rest.data() + rest.size(), zone);
  std::string_view behind = rest.substr(static_cast<std::size_t>(end - rest.data()));
  if (error != std::errc::invalid_argument) {  // a number, and be it too large
    behind = trimmed(behind);
    const char letter = behind.empty() ? ' ' : behind[0];
    south = letter == 'S' || letter == 's';
    if (!south && letter != 'N' && letter != 'n') {
      throw Error(quoted(text) + " must say N or S after the zone, as in \"utm:30N\".");
    }
    behind.remove_prefix(1);
    if (zone < 1 || zone > 60) {
      throw Error("UTM has zones 1 to 60; " + quoted(text) + " names another.");
    }
  } else {
    if (!where) {
      throw Error(quoted(text) + " needs a zone, as in \"utm:30N\", or a point to find it from.");
    }
    zone = zone_at(*where, text);
    if (zone == 0) {
      throw Error(
          "UTM reaches from 80 degrees south to 84 degrees north; \"ups\" serves the poles.");
    }
    south = where->latitude < 0;
  }
  behind = trimmed(behind);
  if (behind.empty() || folded(behind) == "wgs84" || folded(behind) == "wgs 84") {
    return definition_from_registry((south ? 32700 : 32600) + zone);
  }
  const Definition base = geographic_named(behind);
  const std::string name = base.name + " / UTM zone " + std::to_string(zone) + (south ? "S" : "N");
  if (const auto known = Registry::shared().system(name)) {
    return definition_from_registry(known->code);
  }
  // Zones count from Greenwich, whatever the meridian of the base.
  return projected_on(base, name, 9807,
                      {{kLat0, 0},
                       {kLon0, (zone * 6 - 183) * kDegree - base.datum.meridian.longitude},
                       {kK0, 0.9996},
                       {kX0, 500000},
                       {kY0, south ? 10000000.0 : 0.0}});
}

Definition ups(std::string_view rest, const std::optional<Where>& where, std::string_view text) {
  const std::string side = folded(rest);
  bool south = side == "s" || side == "south";
  if (side.empty() && where) {
    zone_at(*where, text);
    south = where->latitude < 0;
  } else if (!south && side != "n" && side != "north") {
    throw Error(quoted(text) + " must say N or S, as in \"ups:N\", or come with a point.");
  }
  return definition_from_registry(south ? 5042 : 5041);
}

// References of the military grid are texts; the numbers in them are those of a zone of UTM or of
// UPS, which a point, a reference or the letters of a zone name.
Definition military_grid(std::string_view rest, const std::optional<Where>& where,
                         std::string_view text) {
  const auto zone_of = [](int zone, bool north) {
    return definition_from_registry(zone == 0 ? (north ? 5041 : 5042)
                                              : (north ? 32600 : 32700) + zone);
  };
  if (rest.empty()) {
    if (!where) {
      throw Error(quoted(text) +
                  " is a text form of positions on WGS 84: parse_mgrs() and format_mgrs() read and "
                  "write references; a zone's numbers are \"utm:31N\", \"ups:N\" or, by a "
                  "reference, \"mgrs:31UDQ\".");
    }
    return zone_of(zone_at(*where, text), where->latitude >= 0);
  }
  // A zone alone, "31U" or "Z", or a whole reference.
  int zone = 0;
  const auto [end, error] = std::from_chars(rest.data(), rest.data() + rest.size(), zone);
  const std::string letter = folded(rest.substr(static_cast<std::size_t>(end - rest.data())));
  if (letter.size() == 1) {
    const bool polar = error != std::errc();
    const std::string_view bands = polar ? "abyz" : "cdefghjklmnpqrstuvwx";
    if (bands.find(letter[0]) != std::string_view::npos && (polar || (zone >= 1 && zone <= 60))) {
      return zone_of(polar ? 0 : zone, polar ? letter[0] > 'm' : letter[0] >= 'n');
    }
  }
  const GridPosition grid = parse_mgrs(rest);
  if (!grid) throw Error(grid.reason);
  return zone_of(grid.zone, grid.north);
}

Definition state_plane(std::string_view rest, bool of_1983) {
  int16_t type;
  double lon0, lat0, x0, y0, k0, lat1 = 0, lat2 = 0, lon_c = 0, lat_c = 0, azimuth = 0;
  TWstatus status;
  const std::string zone(rest);
  const bool digits = !zone.empty() && std::all_of(zone.begin(), zone.end(),
                                                   [](char c) { return c >= '0' && c <= '9'; });
  (of_1983 ? TWspcs83 : TWspcs27)(zone.c_str(), &type, &lon0, &lat0, &x0, &y0, &k0, &lat1, &lat2,
                                  &lon_c, &lat_c, &azimuth, &status);
  if (!digits || !TW_OK(status)) {
    throw Error("There is no state plane zone " + quoted(zone) + " in the system of " +
                (of_1983 ? "1983." : "1927."));
  }
  const Definition base = definition_from_registry(of_1983 ? 4269 : 4267);
  const std::string name = base.name + " / state plane zone " + zone;
  Definition result;
  if (type == 0) {
    result = projected_on(base, name, 9807,
                          {{kLat0, lat0}, {kLon0, lon0}, {kK0, k0}, {kX0, x0}, {kY0, y0}});
  } else if (type == 1) {
    result = projected_on(
        base, name, 9802,
        {{kLatF, lat0}, {kLonF, lon0}, {kLat1, lat1}, {kLat2, lat2}, {kXF, x0}, {kYF, y0}});
  } else {
    result = projected_on(base, name, 9812,
                          {{kLatC, lat_c},
                           {kLonC, lon_c},
                           {kAzimuth, azimuth},
                           {kRectifiedAngle, azimuth},
                           {kLineScale, k0},
                           {kX0, x0},
                           {kY0, y0}});
  }
  if (!of_1983) result.unit = {"US survey foot", 9003, kUsSurveyFoot};
  return result;
}

Definition geocentric(std::string_view rest) {
  Definition result = geographic_named(rest.empty() ? "wgs84" : rest);
  if (result.kind == SystemKind::geocentric) return result;
  result.base = result.name;
  result.base_code = result.code;
  result.name = result.name + " geocentric";
  result.code = 0;
  result.kind = SystemKind::geocentric;
  result.unit = {"metre", 9001, 1};
  result.axes = "XYZ";
  return result;
}

// --- definitions in one line --------------------------------------------------------------------

struct Given {
  std::string key;
  std::string value;
  bool used = false;
};

class OneLine {
 public:
  explicit OneLine(std::string_view text) : text_(text) {
    std::string words;
    for (const std::string& word : words_of(text)) {
      const auto equals = word.find('=');
      if (equals == std::string::npos) {
        if (!given_.empty()) refuse(quoted(word) + " is no name=value");
        words += (words.empty() ? "" : " ") + word;
      } else {
        const std::string key = folded(word.substr(0, equals));
        if (has(key)) refuse(quoted(key) + " is given twice");
        given_.push_back({key, word.substr(equals + 1)});
      }
    }
    method_words_ = words;
  }

  Definition definition() {
    Definition result = base();
    result.name = std::string(trimmed(text_));
    if (const auto name = take("name")) result.name = *name;
    const std::string kind = folded(method_words_);
    if (kind == "geographic" || kind == "longlat" || kind == "latlong") {
      result.kind = SystemKind::geographic2d;
      result.unit = {"degree", 9102, kDegree};
      result.axes = "EN";
    } else {
      result.kind = SystemKind::projected;
      result.unit = {"metre", 9001, 1};
      result.axes = "EN";
      method_and_parameters(result);
    }
    if (const auto axes = take("axes")) {
      result.axes = *axes;
      if (axes->size() != 2 || !horizontal_axes(*axes)) {
        refuse("axes must be two letters of E, N, W and S, one along each direction");
      }
    }
    for (const Given& given : given_) {
      if (!given.used) refuse(unknown(given.key, result));
    }
    return result;
  }

 private:
  [[noreturn]] void refuse(const std::string& why) const {
    throw Error("The definition " + quoted(text_) + " cannot be used: " + why + ".");
  }

  std::optional<std::string> take(std::string_view key) {
    for (Given& given : given_) {
      if (given.key != key) continue;
      given.used = true;
      return given.value;
    }
    return std::nullopt;
  }
  std::optional<double> take_number(std::string_view key) {
    const auto text = take(key);
    if (!text) return std::nullopt;
    const auto value = number(*text);
    if (!value) refuse(quoted(*text) + " is no number");
    return value;
  }
  bool has(std::string_view key) const {
    return std::any_of(given_.begin(), given_.end(),
                       [&](const Given& given) { return given.key == key; });
  }

  // Datum, ellipsoid and prime meridian.
  Definition base() {
    Definition result;
    if (const auto datum = take("datum")) {
      const Definition known = geographic_named(*datum);
      result.datum = known.datum;
      result.base = known.name;
      result.base_code = known.code;
    } else if (const auto ellipsoid = take("ellps")) {
      const Ellipsoid named(*ellipsoid);
      result.datum.ellipsoid = {named.name(), named.code(), named.a(), named.inverse_flattening()};
    } else if (const auto a = take_number("a")) {
      double inverse_flattening = 0;
      if (const auto rf = take_number("rf")) inverse_flattening = *rf;
      if (const auto b = take_number("b")) inverse_flattening = *b == *a ? 0 : *a / (*a - *b);
      const Ellipsoid figures(*a, inverse_flattening);
      result.datum.ellipsoid = {"", 0, figures.a(), figures.inverse_flattening()};
    } else {
      refuse("it names no datum= and no ellps=");
    }
    if (result.datum.name.empty()) result.datum.name = unknown_datum(result.datum.ellipsoid);
    if (const auto pm = take("pm")) {
      if (const auto degrees = number(*pm)) {
        if (std::fabs(*degrees) > 360) refuse("pm is beyond a whole turn");
        result.datum.meridian = {"", 0, *degrees * kDegree};
      } else {
        const PrimeMeridian named(*pm);
        result.datum.meridian = {named.name(), named.code(), named.longitude() * kDegree};
      }
    }
    if (const auto towgs84 = take("towgs84")) {
      std::array<double, 7> seven = {};
      std::size_t n = 0;
      std::string_view rest = *towgs84;
      while (true) {
        const auto comma = rest.find(',');
        const auto value = number(rest.substr(0, comma));
        if (!value || n == 7) refuse("towgs84 takes three or seven numbers");
        seven[n++] = *value;
        if (comma == std::string_view::npos) break;
        rest.remove_prefix(comma + 1);
      }
      if (n != 3 && n != 7) refuse("towgs84 takes three or seven numbers");
      result.datum.to_wgs84 = seven;
    }
    return result;
  }

  void method_and_parameters(Definition& result) {
    const Method* method = method_by_words(method_words_);
    if (method == nullptr) {
      refuse("there is no projection method " + quoted(method_words_));
    }
    // What is given tells the variant.
    const bool first = has("lat1") || has("lat 1") || has("lat ts");
    const bool second = has("lat2") || has("lat 2");
    if (method->code == 9802 && !first && !second) method = method_by_code(9801);
    if (method->code == 9805 && (has("k0") || has("k 0"))) method = method_by_code(9804);
    if (method->code == 9810 && first) method = method_by_code(9829);
    result.method = method->code;
    if (const auto units = take("units")) {
      const Unit unit(*units);
      if (unit.kind() != Unit::Kind::length) refuse(quoted(*units) + " is no unit of length");
      result.unit = {unit.name(), unit.code(), unit.factor()};
    }
    for (const MethodParameter& parameter : method->parameters) {
      const ParameterKind& kind = *parameter_kind(parameter.code);
      auto value = take_number(kind.short_form);
      if (!value) value = take_number(folded(parameter.proj));
      if (!value) continue;
      result.parameters.push_back(
          {parameter.code, kind.quantity == Quantity::angle ? *value * kDegree : *value});
    }
    if (method->code == 9802 && !second) {
      result.parameters.push_back({kLat2, result.parameter(kLat1)});
    }
  }

  std::string unknown(const std::string& key, const Definition& definition) const {
    std::string sentence = quoted(key) + " is not known here";
    if (const Method* method = method_by_code(definition.method)) {
      sentence += "; " + std::string(method->name) + " takes";
      for (const MethodParameter& parameter : method->parameters) {
        sentence += " " + std::string(parameter_kind(parameter.code)->short_form);
      }
    }
    return sentence;
  }

  std::string_view text_;
  std::string method_words_;
  std::vector<Given> given_;
};

Definition by_registry_name(std::string_view text) {
  const Registry& registry = Registry::shared();
  if (const auto known = registry.system(text)) return definition_from_registry(known->code);
  const auto found = registry.search(text, 4);
  if (found.size() == 1) return definition_from_registry(found[0].code);
  std::string sentence = "There is no coordinate system " + quoted(text);
  if (!found.empty()) {
    sentence = quoted(text) + " could be several coordinate systems";
    for (std::size_t i = 0; i < found.size(); ++i) {
      sentence += (i == 0 ? ": " : "; ") + std::string("EPSG:") + std::to_string(found[i].code) +
                  " " + found[i].name;
    }
  } else {
    const auto near = registry.suggest(text);
    for (std::size_t i = 0; i < near.size(); ++i) {
      sentence += (i == 0 ? "; the nearest names are " : ", ") + quoted(near[i]);
    }
  }
  throw Error(sentence + ".");
}

Definition compound_of(int horizontal, int vertical) {
  Definition result = definition_from_registry(horizontal);
  const Definition height = definition_from_registry(vertical);
  const bool plane =
      result.kind == SystemKind::projected || result.kind == SystemKind::geographic2d;
  if (height.kind != SystemKind::vertical || !plane) {
    throw Error("EPSG:" + std::to_string(horizontal) + "+" + std::to_string(vertical) +
                " must be a horizontal system and a vertical one.");
  }
  result.name += " + " + height.name;
  result.code = 0;
  result.horizontal_code = horizontal;
  result.vertical_name = height.vertical_name;
  result.vertical_code = height.vertical_code;
  result.vertical_datum = height.vertical_datum;
  result.vertical_unit = height.vertical_unit;
  result.axes += height.axes;
  result.kind = SystemKind::compound;
  return result;
}

}  // namespace

Definition definition_from_text(std::string_view text, const std::optional<Where>& where) {
  text = trimmed(text);
  if (text.empty()) throw Error("The name of the coordinate system is empty.");
  if (const auto code = registry_code(text)) return definition_from_registry(*code);
  if (const auto plus = text.find('+'); plus != std::string_view::npos && plus > 0) {
    const auto horizontal = registry_code(text.substr(0, plus));
    const auto vertical = registry_code(text.substr(plus + 1));
    if (horizontal && vertical) return compound_of(*horizontal, *vertical);
  }
  if (text.find('[') != std::string_view::npos) return definition_from_wkt(text);
  if (text.starts_with('+') || text.starts_with("proj=") ||
      text.find(" proj=") != std::string_view::npos ||
      text.find("+proj=") != std::string_view::npos) {
    return definition_from_proj(text);
  }
  if (text.find('=') != std::string_view::npos) return OneLine(text).definition();

  const auto [head, rest] = headed(text);
  if (head == "epsg" && number(rest)) {
    if (const auto code = registry_code(rest)) return definition_from_registry(*code);
    throw Error("There is no coordinate system " + quoted(text) + ".");
  }
  if (head == "utm") return utm(rest, where, text);
  if (head == "ups") return ups(rest, where, text);
  if (head == "mgrs" || head == "usng") return military_grid(rest, where, text);
  if (head == "spcs83") return state_plane(rest, true);
  if (head == "spcs27") return state_plane(rest, false);
  if (head == "geocentric") return geocentric(rest);
  const std::string whole = folded(text);
  if (whole == "wgs84" || whole == "crs84") return definition_from_registry(4326);
  if (whole == "web mercator") return definition_from_registry(3857);
  return by_registry_name(text);
}

}  // namespace tidewater::detail
