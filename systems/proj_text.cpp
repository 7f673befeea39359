// Definitions from and to PROJ strings.

#include <algorithm>
#include <charconv>
#include <cmath>
#include <optional>

#include "angle_text.hpp"
#include "makers.hpp"
#include "number_text.hpp"
#include "system_impl.hpp"
#include "text_forms.hpp"
#include "text_forms_parts.hpp"
#include "tidewater/ellipsoid.hpp"
#include "words.hpp"

namespace tidewater::detail {

namespace {

constexpr std::size_t kLongest = 1 << 16;

// The datums that PROJ knows by name, as the registry has them.
struct NamedDatum {
  std::string_view name;
  int code;
  int base;
};
constexpr NamedDatum kDatums[] = {
    {"WGS84", 6326, 4326},         {"GGRS87", 6121, 4121},  {"NAD83", 6269, 4269},
    {"NAD27", 6267, 4267},         {"potsdam", 6314, 4314}, {"carthage", 6223, 4223},
    {"hermannskogel", 6312, 4312}, {"ire65", 6300, 4300},   {"nzgd49", 6272, 4272},
    {"OSGB36", 6277, 4277},
};

struct NamedUnit {
  std::string_view name;
  double factor;
};
constexpr double kUsFoot = 1200.0 / 3937.0;
constexpr NamedUnit kUnits[] = {
    {"m", 1},
    {"km", 1000},
    {"dm", 0.1},
    {"cm", 0.01},
    {"mm", 0.001},
    {"ft", 0.3048},
    {"us-ft", kUsFoot},
    {"yd", 0.9144},
    {"us-yd", 3 * kUsFoot},
    {"in", 0.0254},
    {"us-in", kUsFoot / 12},
    {"mi", 1609.344},
    {"us-mi", 5280 * kUsFoot},
    {"kmi", 1852},
    {"fath", 1.8288},
    {"ch", 20.1168},
    {"us-ch", 66 * kUsFoot},
    {"link", 0.201168},
    {"ind-yd", 0.91439523},
    {"ind-ft", 0.30479841},
    {"ind-ch", 20.11669506},
};

struct NamedMeridian {
  std::string_view name;
  double degrees;
};
constexpr NamedMeridian kMeridians[] = {
    {"greenwich", 0},
    {"lisbon", -(9 + 7 / 60.0 + 54.862 / 3600)},
    {"paris", 2.33722917},
    {"bogota", -(74 + 4 / 60.0 + 51.3 / 3600)},
    {"madrid", -(3 + 41 / 60.0 + 16.58 / 3600)},
    {"rome", 12 + 27 / 60.0 + 8.4 / 3600},
    {"bern", 7 + 26 / 60.0 + 22.5 / 3600},
    {"jakarta", 106 + 48 / 60.0 + 27.79 / 3600},
    {"ferro", -(17 + 40 / 60.0)},
    {"brussels", 4 + 22 / 60.0 + 4.71 / 3600},
    {"stockholm", 18 + 3 / 60.0 + 29.8 / 3600},
    {"athens", 23 + 42 / 60.0 + 58.815 / 3600},
    {"oslo", 10 + 43 / 60.0 + 22.5 / 3600},
};

// Ellipsoids by PROJ's names.
struct NamedEllipsoid {
  std::string_view name;
  double a;
  double rf;  // 0: sphere
};
constexpr NamedEllipsoid kEllipsoids[] = {
    {"GRS80", 6378137, 298.257222101},
    {"WGS84", 6378137, 298.257223563},
    {"WGS72", 6378135, 298.26},
    {"WGS66", 6378145, 298.25},
    {"GRS67", 6378160, 298.2471674270},
    {"airy", 6377563.396, 299.3249646},
    {"mod_airy", 6377340.189, 299.3249646},
    {"aust_SA", 6378160, 298.25},
    {"bessel", 6377397.155, 299.1528128},
    {"bess_nam", 6377483.865, 299.1528128},
    {"clrk66", 6378206.4, 6378206.4 / (6378206.4 - 6356583.8)},
    {"clrk80", 6378249.145, 293.4663},
    {"clrk80ign", 6378249.2, 293.4660212936269},
    {"evrst30", 6377276.345, 300.8017},  // Everest 1830 (1937 Adjustment)
    {"evrst48", 6377304.063, 300.8017},  // Everest 1830 Modified
    {"evrst56", 6377301.243, 300.8017},  // Everest 1830 (1962 Definition)
    {"evrst69", 6377295.664, 300.8017},  // Everest 1830 (RSO 1969)
    {"evrstSS", 6377298.556, 300.8017},  // Everest 1830 (1967 Definition)
    {"fschr60", 6378166, 298.3},
    {"helmert", 6378200, 298.3},
    {"hough", 6378270, 297},
    {"intl", 6378388, 297},
    {"krass", 6378245, 298.3},
    {"NWL9D", 6378145, 298.25},
    {"PZ90", 6378136, 298.25784},
    {"CGCS2000", 6378137, 298.257222101},
    {"IAU76", 6378140, 298.257},
    {"GSK2011", 6378136.5, 298.2564151},
    {"danish", 6377019.2563, 300},
    {"new_intl", 6378157.5, 6378157.5 / (6378157.5 - 6356772.2)},
    {"plessis", 6376523, 6376523 / (6376523.0 - 6355863)},
    {"sphere", 6370997, 0},  // Clarke 1866 Authalic Sphere
};

struct Given {
  std::string_view key;
  std::string_view value;
  bool has_value = false;
  bool used = false;
};

class Words {
 public:
  explicit Words(std::string_view text) : text_(text) {
    if (text.size() > kLongest) throw Error("The PROJ string is longer than 64 kilobytes.");
    std::size_t at = 0;
    while (at < text.size()) {
      while (at < text.size() && blank(text[at])) ++at;
      std::size_t end = at;
      while (end < text.size() && !blank(text[end])) ++end;
      std::string_view word = text.substr(at, end - at);
      at = end;
      if (word.starts_with('+')) word.remove_prefix(1);
      if (word.empty()) continue;
      const auto equals = word.find('=');
      Given given{word.substr(0, equals), {}, equals != word.npos, false};
      if (given.has_value) given.value = word.substr(equals + 1);
      if (given_.size() == 100) throw Error("The PROJ string has more than a hundred words.");
      // The first of several counts.
      if (peek(given.key) == nullptr) given_.push_back(given);
    }
  }

  const Given* peek(std::string_view key) const {
    for (const Given& given : given_) {
      if (given.key == key) return &given;
    }
    return nullptr;
  }
  bool has(std::string_view key) const { return peek(key) != nullptr; }

  std::optional<std::string_view> take(std::string_view key) {
    for (Given& given : given_) {
      if (given.key != key) continue;
      given.used = true;
      return given.value;
    }
    return std::nullopt;
  }
  bool flag(std::string_view key) {
    const auto value = take(key);
    return value && *value != "f" && *value != "F";
  }

  std::optional<double> take_number(std::string_view key) {
    const auto value = take(key);
    if (!value) return std::nullopt;
    return number(key, *value);
  }
  double number(std::string_view key, std::string_view text) const {
    double result = 0;
    std::string_view digits = text;
    if (digits.starts_with('+')) digits.remove_prefix(1);
    const auto read = std::from_chars(digits.data(), digits.data() + digits.size(), result);
    if (read.ec != std::errc() || read.ptr != digits.data() + digits.size() ||
        !std::isfinite(result)) {
      refuse("+" + std::string(key) + "=" + std::string(text.substr(0, 40)) + " is no number");
    }
    return result;
  }
  // Radians from degrees in any form, or from a number with r behind it.
  std::optional<double> take_angle(std::string_view key) {
    const auto value = take(key);
    if (!value) return std::nullopt;
    return angle(key, *value);
  }
  double angle(std::string_view key, std::string_view text) const {
    if (text.size() > 1 && (text.back() == 'r' || text.back() == 'R')) {
      return number(key, text.substr(0, text.size() - 1));
    }
    if (text.find_first_of("dD:'\"NSEWnsw") != text.npos) {
      const ParsedAngle angle = parse_angle(text);
      if (!angle) refuse("+" + std::string(key) + ": " + angle.reason);
      return angle.degrees * kDegreeInRadians;
    }
    return number(key, text) * kDegreeInRadians;
  }

  [[noreturn]] void refuse(std::string why) const {
    if (why.ends_with('.')) why.pop_back();
    throw Error("The PROJ string " + quoted(text_) + " cannot be used: " + why + ".");
  }

  // Whatever would change figures and was not understood.
  void refuse_unused(const Method* method, std::initializer_list<std::string_view> harmless) {
    for (const std::string_view key : harmless) take(key);
    for (const Given& given : given_) {
      if (given.used) continue;
      // A zero, or a scale of one, changes nothing.
      double value = 1;
      std::from_chars(given.value.data(), given.value.data() + given.value.size(), value);
      const bool scale = given.key == "k" || given.key == "k_0";
      if (given.has_value && value == (scale ? 1 : 0)) continue;
      std::string why = "+" + std::string(given.key.substr(0, 40)) + " is not known here";
      if (method != nullptr) {
        why += "; " + std::string(method->name) + " takes";
        for (const MethodParameter& parameter : method->parameters) {
          if (!parameter.proj.empty()) why += " +" + std::string(parameter.proj);
        }
      }
      refuse(why);
    }
  }

 private:
  static bool blank(char c) { return c == ' ' || c == '\t' || c == '\n' || c == '\r'; }

  std::string_view text_;
  std::vector<Given> given_;
};

// GRS 1980 where the words tell none; whether they do.
bool read_ellipsoid(Words& words, Definition& definition) {
  EllipsoidDefinition& ellipsoid = definition.datum.ellipsoid;
  if (const auto name = words.take("ellps")) {
    const auto found = std::find_if(std::begin(kEllipsoids), std::end(kEllipsoids),
                                    [&](const NamedEllipsoid& e) { return e.name == *name; });
    if (found == std::end(kEllipsoids)) {
      const Ellipsoid named(*name);
      ellipsoid = {named.name(), named.code(), named.a(), named.inverse_flattening()};
    } else {
      ellipsoid = {std::string(found->name), 0, found->a, found->rf};
    }
  }
  if (const auto radius = words.take_number("R")) ellipsoid = {"sphere", 0, *radius, 0};
  if (const auto a = words.take_number("a")) ellipsoid = {"", 0, *a, ellipsoid.inverse_flattening};
  const bool sized = words.has("ellps") || words.has("R") || words.has("a");
  for (const std::string_view shape : {"b", "rf", "f", "es"}) {
    if (!sized && words.has(shape)) {
      words.refuse("+" + std::string(shape) + " needs the semi-major axis +a beside it");
    }
  }
  if (!sized) ellipsoid = {"GRS 1980", 7019, 6378137, 298.257222101};
  if (const auto b = words.take_number("b")) {
    if (!(*b > 0) || *b > ellipsoid.a) words.refuse("+b must be above zero and not above +a");
    ellipsoid.inverse_flattening = *b == ellipsoid.a ? 0 : ellipsoid.a / (ellipsoid.a - *b);
  }
  if (const auto rf = words.take_number("rf")) ellipsoid.inverse_flattening = *rf;
  // A flattening that no double tells from zero is a sphere's.
  const auto inverse_of = [](double f) { return std::isfinite(1 / f) ? 1 / f : 0; };
  if (const auto f = words.take_number("f")) ellipsoid.inverse_flattening = inverse_of(*f);
  if (const auto es = words.take_number("es")) {
    if (!(*es >= 0 && *es < 1)) words.refuse("+es must be from zero up to one");
    ellipsoid.inverse_flattening = inverse_of(1 - std::sqrt(1 - *es));
  }
  if (!(ellipsoid.a > 0)) words.refuse("the semi-major axis must be above zero");
  if (ellipsoid.inverse_flattening != 0 && !(ellipsoid.inverse_flattening >= 3)) {
    words.refuse("the inverse flattening must be 3 or more");
  }
  return sized;
}

// Whether this is the pseudo-Mercator of web maps: a sphere for WGS 84 with a grid that is none.
bool is_web_mercator(const Words& words) {
  const Given* grids = words.peek("nadgrids");
  const Given* proj = words.peek("proj");
  const Given* a = words.peek("a");
  const Given* b = words.peek("b");
  return proj != nullptr && proj->value == "merc" && grids != nullptr && grids->value == "@null" &&
         a != nullptr && b != nullptr && words.number("a", a->value) == 6378137 &&
         words.number("b", b->value) == 6378137;
}

void read_datum(Words& words, Definition& definition) {
  DatumDefinition& datum = definition.datum;
  const auto name = words.take("datum");
  const auto known = std::find_if(std::begin(kDatums), std::end(kDatums), [&](const NamedDatum& d) {
    return name && bare(d.name) == bare(*name);
  });
  if (name && known == std::end(kDatums)) {
    words.refuse("+datum=" + std::string(name->substr(0, 40)) + " is not known here");
  }
  const bool web = is_web_mercator(words);
  if (name || web) {
    const NamedDatum& found = web ? kDatums[0] : *known;
    datum = datum_from_registry(found.code);
    definition.base_code = found.base;
    definition.base = definition_from_registry(found.base).name;
    // An ellipsoid beside it must be its own; that of web maps is none.
    Definition told;
    const bool own = read_ellipsoid(words, told);
    if (own && !web && !same_figures(told.datum.ellipsoid, datum.ellipsoid)) {
      words.refuse("its ellipsoid is not that of +datum=" + std::string(found.name));
    }
  } else {
    read_ellipsoid(words, definition);
    datum.name = unknown_datum(datum.ellipsoid);
  }
  const auto grids = words.take("nadgrids");
  if (grids && *grids != "@null") datum.name += " with " + std::string(grids->substr(0, 200));
  if (const auto pm = words.take("pm")) {
    const auto meridian = std::find_if(std::begin(kMeridians), std::end(kMeridians),
                                       [&](const NamedMeridian& m) { return m.name == bare(*pm); });
    if (meridian != std::end(kMeridians)) {
      datum.meridian = {std::string(*pm), 0, meridian->degrees * kDegreeInRadians};
    } else {
      datum.meridian = {"", 0, words.angle("pm", *pm)};
      if (std::fabs(datum.meridian.longitude) > 2 * kPi) words.refuse("+pm is beyond a whole turn");
    }
  }
  if (const auto shift = words.take("towgs84")) {
    std::array<double, 7> seven{};
    std::size_t n = 0;
    std::string_view rest = *shift;
    while (n < 7) {
      const auto comma = rest.find(',');
      seven[n++] = words.number("towgs84", rest.substr(0, comma));
      if (comma == rest.npos) {
        rest = {};
        break;
      }
      rest.remove_prefix(comma + 1);
    }
    if ((n != 3 && n != 7) || !rest.empty()) words.refuse("+towgs84 takes three or seven numbers");
    datum.to_wgs84 = seven;
  }
}

UnitDefinition read_unit(Words& words) {
  UnitDefinition unit{"metre", 9001, 1};
  const auto name = words.take("units");
  if (name) {
    const auto known = std::find_if(std::begin(kUnits), std::end(kUnits),
                                    [&](const NamedUnit& u) { return u.name == *name; });
    if (known == std::end(kUnits)) {
      words.refuse("+units=" + std::string(name->substr(0, 40)) + " is no unit of length");
    }
    if (known->factor != 1) unit = {std::string(*name), 0, known->factor};
    if (*name == "ft") unit = {"foot", 9002, 0.3048};
    if (*name == "us-ft") unit = {"US survey foot", 9003, kUsFoot};
  }
  if (const auto text = words.take("to_meter")) {
    const auto slash = text->find('/');
    double factor = words.number("to_meter", text->substr(0, slash));
    if (slash != text->npos) factor /= words.number("to_meter", text->substr(slash + 1));
    if (!(factor > 0) || !std::isfinite(factor)) words.refuse("+to_meter must be above zero");
    if (name && std::fabs(factor - unit.factor) > 1e-9 * factor) {
      words.refuse("+units and +to_meter are two different units");
    }
    if (factor != unit.factor) unit = {"", 0, factor};
  }
  return unit;
}

// "enu", "wsu" ... in capitals, without the third.
std::string read_axes(Words& words) {
  const auto axis = words.take("axis");
  if (!axis) return "EN";
  std::string axes;
  for (const char c : *axis) {
    axes += c >= 'a' && c <= 'z' ? static_cast<char>(c - 32) : c;
  }
  const bool upright = axes.size() == 3 && (axes[2] == 'U' || axes[2] == 'D');
  axes.resize(2);
  if (!upright || !horizontal_axes(axes)) {
    words.refuse("+axis takes e or w and n or s, in either order, and then u or d");
  }
  return axes;
}

// Whether the axes point to these two directions, in either order.
bool points_to(std::string_view axes, std::string_view directions) {
  return axes.find(directions[0]) != axes.npos && axes.find(directions[1]) != axes.npos;
}

// PROJ adds its false origin to eastings and northings, before it turns the axes; the methods that
// count to the west or south, and Krovak's turned to the north, have it along the former.
double false_origin(int method, int parameter, double value) {
  const bool krovak = method == 9819 || method == 1041;
  const bool west = krovak || method == 9808 || method == 9826 || method == 9828;
  const bool south = west && method != 9826;
  return (west && parameter == kX0) || (south && parameter == kY0) ? 0 - value : value;
}

// Of the methods that have this name, by what else is given.
int method_code(Words& words, std::string_view name, const std::string& axes) {
  const auto zero = [&](std::string_view key) {
    const Given* given = words.peek(key);
    return given == nullptr || words.angle(key, given->value) == 0;
  };
  const auto angle = [&](std::string_view key) {
    const Given* given = words.peek(key);
    return given == nullptr ? 0 : words.angle(key, given->value);
  };
  const bool scaled = words.has("k") || words.has("k_0");
  const bool polar = std::fabs(std::fabs(angle("lat_0")) - kHalfPi) < 1e-9;
  if (name == "tmerc" || name == "etmerc") return points_to(axes, "WS") ? 9808 : 9807;
  if (name == "utm") return 9807;
  if (name == "lcc") {
    const Given* first = words.peek("lat_1");
    const Given* second = words.peek("lat_2");
    if (second != nullptr && (first == nullptr || second->value != first->value)) {
      const Given* k = words.peek(words.has("k_0") ? "k_0" : "k");
      return k != nullptr && words.number("k_0", k->value) != 1 ? 1051 : 9802;
    }
    const bool same = !words.has("lat_0") || std::fabs(angle("lat_0") - angle("lat_1")) < 1e-12;
    if (same) return points_to(axes, "WN") ? 9826 : 9801;
    return scaled ? 1102 : 9802;
  }
  if (name == "merc") {
    if (is_web_mercator(words)) return 1024;
    // With a parallel of true scale there is no other scale, were it the equator.
    const Given* k = words.peek(words.has("k_0") ? "k_0" : "k");
    const bool other = k != nullptr && words.number(k->key, k->value) != 1;
    return zero("lat_ts") && !(other && words.has("lat_ts")) ? 9804 : 9805;
  }
  if (name == "webmerc") return 1024;
  if (name == "omerc") {
    if (words.has("lat_1") || words.has("lon_1")) return kTwoPointOblique;
    return words.flag("no_uoff") || words.flag("no_off") ? 9812 : 9815;
  }
  if (name == "krovak") return points_to(axes, "SW") ? 9819 : 1041;
  if (name == "mod_krovak") return points_to(axes, "SW") ? 1042 : 1043;
  if (name == "stere" || name == "ups") {
    if (!polar) return name == "ups" ? 9810 : kStereographic;
    return words.has("lat_ts") && std::fabs(std::fabs(angle("lat_ts")) - kHalfPi) > 1e-12 ? 9829
                                                                                          : 9810;
  }
  if (name == "bonne") return points_to(axes, "WS") ? 9828 : 9827;
  if (name == "cass") return words.flag("hyperbolic") ? 9833 : 9806;
  if (name == "aeqd") return words.flag("guam") ? 9831 : int{kAzimuthalEquidistant};
  if (name == "laea") return 9820;
  if (name == "cea") return 9835;
  if (name == "eqc") return 1029;
  if (name == "ortho") return 9840;
  for (const Method& method : methods()) {
    if (method.proj == name) return method.code;
  }
  words.refuse("there is no projection " + quoted(name));
}

void read_parameters(Words& words, const Method& method, Definition& definition) {
  const double lat0 = words.take_angle("lat_0").value_or(0);
  for (const MethodParameter& parameter : method.parameters) {
    const ParameterKind& kind = *parameter_kind(parameter.code);
    std::optional<double> value;
    if (parameter.proj == "lat_0") {
      if (words.has("lat_0")) value = lat0;
    } else if (parameter.proj == "k_0") {
      value = words.take_number("k_0");
      const auto k = words.take_number("k");
      if (!value) value = k;
    } else if (!parameter.proj.empty()) {
      value = kind.quantity == Quantity::angle ? words.take_angle(parameter.proj)
                                               : words.take_number(parameter.proj);
    }
    if (value) {
      definition.parameters.push_back(
          {parameter.code, false_origin(method.code, parameter.code, *value)});
    }
  }
  const auto set = [&](int code, double value) {
    for (ParameterValue& given : definition.parameters) {
      if (given.code == code) {
        given.value = value;
        return;
      }
    }
    definition.parameters.push_back({code, value});
  };
  const auto lacks = [&](int code) {
    return std::none_of(definition.parameters.begin(), definition.parameters.end(),
                        [code](const ParameterValue& given) { return given.code == code; });
  };
  switch (method.code) {
    case 9801:
    case 9826:
      if (lacks(kLat0)) set(kLat0, lat0);
      words.take("lat_2");
      break;
    case 9802:
      if (lacks(kLat2)) set(kLat2, definition.parameter(kLat1));
      break;
    case 9812:
    case 9815:
      if (lacks(kRectifiedAngle)) set(kRectifiedAngle, definition.parameter(kAzimuth));
      break;
    case 9829:
      set(kLatTrue, std::copysign(definition.parameter(kLatTrue), lat0));
      break;
    case 9810:
      set(kLat0, std::copysign(kHalfPi, lat0));
      words.take("lat_ts");
      break;
    case 9819:
    case 1041:
    case 1042:
    case 1043:
      // What the projection is by itself.
      if (lacks(kLatC)) set(kLatC, 49.5 * kDegreeInRadians);
      if (lacks(kLonOrigin)) set(kLonOrigin, (24 + 50 / 60.0) * kDegreeInRadians);
      if (lacks(kColatitude)) {
        set(kColatitude, (30 + 17 / 60.0 + 17.30311 / 3600) * kDegreeInRadians);
      }
      if (lacks(kPseudoScale)) set(kPseudoScale, 0.9999);
      set(kPseudoParallel, 78.5 * kDegreeInRadians);
      break;
    default:
      break;
  }
}

void read_zone(Words& words, Definition& definition) {
  const auto zone = words.take_number("zone");
  if (!zone || !(*zone >= 1 && *zone <= 60) || *zone != std::floor(*zone)) {
    words.refuse("+proj=utm needs +zone from 1 to 60");
  }
  const bool south = words.flag("south");
  definition.parameters = {{kLat0, 0},
                           {kLon0, (6 * *zone - 183) * kDegreeInRadians},
                           {kK0, 0.9996},
                           {kX0, 500'000},
                           {kY0, south ? 10'000'000.0 : 0.0}};
}

}  // namespace

Definition definition_from_proj(std::string_view text) {
  Words words(text);
  if (words.has("step") || (words.has("proj") && words.peek("proj")->value == "pipeline")) {
    words.refuse("it is a pipeline, which describes an operation and not a system");
  }
  if (const auto init = words.take("init")) {
    const auto colon = init->find(':');
    int code = 0;
    const std::string_view digits = colon == init->npos ? "" : init->substr(colon + 1);
    const auto read = std::from_chars(digits.data(), digits.data() + digits.size(), code);
    if (read.ec != std::errc() || read.ptr != digits.data() + digits.size() ||
        bare(init->substr(0, colon)) != "epsg") {
      words.refuse("+init names no registry code, as in +init=epsg:2154");
    }
    // Some programs write what the code stands for behind it.
    if (!words.has("proj"))
      words.refuse_unused(nullptr, {"no_defs", "type", "wktext", "over", "title"});
    return definition_from_registry(code);
  }
  const auto name = words.take("proj");
  if (!name) words.refuse("it has no +proj");

  Definition definition;
  definition.name = "unknown";
  if (const auto title = words.take("title")) definition.name = std::string(*title);
  // The form of web maps names its method by its sphere, which is read as part of the datum.
  const std::string axes = read_axes(words);
  const bool geographic =
      *name == "longlat" || *name == "latlong" || *name == "lonlat" || *name == "latlon";
  const bool geocentric = *name == "geocent" || *name == "cart";
  const int code = geographic || geocentric ? 0 : method_code(words, *name, axes);
  read_datum(words, definition);

  const Method* method = nullptr;
  if (geographic) {
    definition.kind = SystemKind::geographic2d;
    definition.unit = {"degree", 9102, kDegreeInRadians};
    definition.axes = axes;
    words.take("units");
  } else if (geocentric) {
    definition.kind = SystemKind::geocentric;
    definition.unit = read_unit(words);
    definition.axes = "XYZ";
  } else {
    definition.kind = SystemKind::projected;
    definition.unit = read_unit(words);
    definition.axes = axes;
    method = method_by_code(code);
    definition.method = code;
    if (*name == "utm") {
      read_zone(words, definition);
    } else if (*name == "ups") {
      const bool south = words.flag("south");
      definition.parameters = {{kLat0, south ? -kHalfPi : kHalfPi},
                               {kLon0, 0},
                               {kK0, 0.994},
                               {kX0, 2'000'000},
                               {kY0, 2'000'000}};
    } else {
      read_parameters(words, *method, definition);
    }
    complete_parameters(definition, *method);
  }
  words.refuse_unused(
      method, {"proj", "no_defs", "type", "wktext", "vunits", "vto_meter", "geoidgrids", "title",
               "approx", "algo", "over", "ellps", "a", "b", "rf", "f", "es", "datum"});
  return definition;
}

namespace {

std::string datum_words(const DatumDefinition& datum) {
  for (const NamedDatum& known : kDatums) {
    // Where PROJ's own shift is another than what the registry knows, the ellipsoid alone is named.
    if (known.code == datum.code && !datum.to_wgs84 &&
        (known.name == "WGS84" || known.name == "NAD83" || known.name == "NAD27")) {
      return " +datum=" + std::string(known.name);
    }
  }
  const EllipsoidDefinition& ellipsoid = datum.ellipsoid;
  for (const NamedEllipsoid& known : kEllipsoids) {
    if (std::fabs(known.a - ellipsoid.a) < 1e-6 &&
        std::fabs(known.rf - ellipsoid.inverse_flattening) < 1e-9) {
      return " +ellps=" + std::string(known.name);
    }
  }
  if (ellipsoid.inverse_flattening == 0) return " +R=" + number_text(ellipsoid.a);
  return " +a=" + number_text(ellipsoid.a) + " +rf=" + number_text(ellipsoid.inverse_flattening);
}

std::string unit_words(const UnitDefinition& unit) {
  for (const NamedUnit& known : kUnits) {
    if (std::fabs(known.factor - unit.factor) <= 1e-15 * unit.factor) {
      return " +units=" + std::string(known.name);
    }
  }
  return " +to_meter=" + number_text(unit.factor);
}

// Methods whose PROJ namesake has another formula, or another false origin.
std::string_view foreign(const Definition& definition) {
  const bool sphere = definition.datum.ellipsoid.inverse_flattening == 0;
  switch (definition.method) {
    case 9803:
      return "PROJ's cone lacks the angle of this one";
    case 9830:
    case 1044:
      return "PROJ cannot place its false origin";
    case 9832:
      return "PROJ's azimuthal equidistant is another formula";
    case 1027:
    case 9834:
    case 1029:
      return sphere || definition.method == 1029 ? "" : "PROJ takes the ellipsoid's formula";
    case 1028:
    case kChamberlin:
      return sphere ? "" : "PROJ takes the sphere's formula";
    case kLandsat:
      return definition.parameter(kSatellite) == 7 ? "PROJ knows Landsat 1 to 5 alone" : "";
    case 1130:
      return definition.parameter(kAzimuth) != 0 || definition.parameter(kLineScale, 1) != 1
                 ? "PROJ cannot turn or scale it"
                 : "";
    default:
      return "";
  }
}

}  // namespace

std::string proj_from_definition(const Definition& definition) {
  std::string text;
  const auto tail = [&] {
    text += datum_words(definition.datum);
    if (definition.datum.meridian.longitude != 0) {
      text += " +pm=" + degrees_text(definition.datum.meridian.longitude);
    }
    if (definition.datum.to_wgs84) {
      text += " +towgs84=";
      for (std::size_t i = 0; i < 7; ++i) {
        text += (i == 0 ? "" : ",") + number_text((*definition.datum.to_wgs84)[i]);
      }
    }
  };
  if (definition.kind == SystemKind::vertical) {
    throw Error("PROJ strings have no form for " + definition.name +
                ", which is a vertical system.");
  }
  if (definition.kind == SystemKind::geocentric) {
    text = "+proj=geocent";
    tail();
    return text + unit_words(definition.unit) + " +no_defs +type=crs";
  }
  // In what order the axes stand is no matter of a PROJ string, but where they point.
  std::string axis;
  if (!points_to(definition.axes, "EN")) {
    axis = " +axis=";
    for (const char letter : definition.axes.substr(0, 2)) axis += static_cast<char>(letter + 32);
    axis += 'u';
  }
  if (definition.method == 0) {
    text = "+proj=longlat" + axis;
    tail();
    return text + " +no_defs +type=crs";
  }
  const Method& method = method_of(definition);
  std::string why(foreign(definition));
  if (method.proj.empty()) why = "PROJ lacks the method " + std::string(method.name);
  if (!why.empty()) {
    throw Error("PROJ strings have no form for " + definition.name + ": " + why + ".");
  }
  text = "+proj=" + std::string(method.proj.substr(0, method.proj.find(" +axis="))) + axis;
  for (const MethodParameter& parameter : method.parameters) {
    if (parameter.proj.empty()) continue;
    const ParameterKind& kind = *parameter_kind(parameter.code);
    const double value =
        false_origin(method.code, parameter.code, definition.parameter(parameter.code, kind.usual));
    text += " +" + std::string(parameter.proj) + "=" +
            (kind.quantity == Quantity::angle ? degrees_text(value) : number_text(value));
  }
  if (definition.method == 9801 || definition.method == 9826) {
    text += " +lat_0=" + degrees_text(definition.parameter(kLat0));
  }
  if (definition.method == 9829) {
    text += definition.parameter(kLatTrue) < 0 ? " +lat_0=-90" : " +lat_0=90";
  }
  tail();
  return text + unit_words(definition.unit) + " +no_defs +type=crs";
}

}  // namespace tidewater::detail
