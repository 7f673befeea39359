#include "tidewater/ellipsoid.hpp"

#include <cmath>
#include <cstdlib>
#include <numbers>
#include <optional>
#include <span>

#include "registry.hpp"
#include "registry_names.hpp"
#include "words.hpp"

namespace tidewater {

namespace {

// Short names in common use, and what the registry calls them.
struct Alias {
  std::string_view name;
  int code;
};
constexpr Alias kEllipsoids[] = {
    {"grs80", 7019},    {"grs 80", 7019},        {"wgs84", 7030},     {"wgs 84", 7030},
    {"wgs72", 7043},    {"grs67", 7036},         {"clrk66", 7008},    {"clarke66", 7008},
    {"clrk80", 7012},   {"clarke80", 7012},      {"clrk80ign", 7011}, {"intl", 7022},
    {"hayford", 7022},  {"international", 7022}, {"bessel", 7004},    {"bess nam", 7046},
    {"airy", 7001},     {"mod airy", 7002},      {"krass", 7024},     {"krassovsky", 7024},
    {"aust sa", 7003},  {"helmert", 7020},       {"evrst30", 7015},   {"plessis", 7027},
    {"cgcs2000", 1024}, {"pz90", 7054},
};
constexpr Alias kUnits[] = {
    {"m", 9001},       {"meter", 9001},
    {"meters", 9001},  {"metres", 9001},
    {"km", 9036},      {"ft", 9002},
    {"feet", 9002},    {"us ft", 9003},
    {"us foot", 9003}, {"us survey feet", 9003},
    {"ftus", 9003},    {"ind ft", 9080},
    {"yd", 9096},      {"ch", 9097},
    {"link", 9098},    {"deg", 9102},
    {"degrees", 9102}, {"rad", 9101},
    {"radians", 9101}, {"grads", 9105},
    {"gon", 9105},     {"ind yd", 9084},
    {"fath", 9014},    {"kmi", 9030},
    {"us ch", 9033},   {"us mi", 9035},
    {"mi", 9093},
};

int aliased(std::span<const Alias> table, std::string_view name) {
  for (const Alias& alias : table) {
    if (alias.name == name) return alias.code;
  }
  return 0;
}

// A record by an alias, a code or a name.
template <class Get>
auto look_up(std::string_view text, std::span<const Alias> table, const Get& get, const char* what)
    -> typename decltype(get(0))::value_type {
  if (const auto code = detail::registry_code(text)) {
    if (auto record = get(*code)) return *std::move(record);
  } else if (const int alias = aliased(table, detail::folded(text)); alias != 0) {
    if (auto record = get(alias)) return *std::move(record);
  } else if (auto record = get(text)) {
    return *std::move(record);
  }
  throw Error("The registry has no " + std::string(what) + " \"" + std::string(text) + "\".");
}

}  // namespace

Ellipsoid::Ellipsoid(std::string_view name) {
  const auto& registry = detail::Registry::shared();
  const auto record = look_up(
      name, kEllipsoids, [&](auto key) { return registry.ellipsoid(key); }, "ellipsoid");
  name_ = record.name;
  code_ = record.code;
  a_ = record.a;
  inverse_flattening_ = record.inverse_flattening;
}

Ellipsoid::Ellipsoid(double a, double inverse_flattening)
    : a_(a), inverse_flattening_(inverse_flattening) {
  if (!(a > 0) || !std::isfinite(a)) {
    throw Error("An ellipsoid's semi-major axis must be above zero and finite.");
  }
  // A flattening of a third has an eccentricity of 0.75; no formula here serves more.
  if (inverse_flattening != 0 && !(inverse_flattening >= 3)) {
    throw Error("An ellipsoid's inverse flattening must be 3 or more, or 0 for a sphere.");
  }
}

std::vector<std::string> Ellipsoid::names() {
  const detail::Registry& registry = detail::Registry::shared();
  std::vector<std::string> list;
  for (const int code : registry.ellipsoids()) list.push_back(registry.ellipsoid(code)->name);
  return list;
}

double Ellipsoid::b() const { return a_ * (1 - flattening()); }

double Ellipsoid::eccentricity() const { return std::sqrt(flattening() * (2 - flattening())); }

PrimeMeridian::PrimeMeridian(std::string_view name) {
  const auto& registry = detail::Registry::shared();
  const auto record = look_up(
      name, {}, [&](auto key) { return registry.meridian(key); }, "prime meridian");
  name_ = record.name;
  code_ = record.code;
  longitude_ = record.longitude * (180 / std::numbers::pi);
}

Unit::Unit(std::string_view name) {
  const auto& registry = detail::Registry::shared();
  const auto record = look_up(
      name, kUnits, [&](auto key) { return registry.unit(key); }, "unit");
  name_ = record.name;
  code_ = record.code;
  factor_ = record.factor;
  switch (record.kind) {
    case detail::UnitRecord::Kind::length:
      kind_ = Kind::length;
      return;
    case detail::UnitRecord::Kind::angle:
      kind_ = Kind::angle;
      return;
    default:
      kind_ = Kind::scale;
  }
}

}  // namespace tidewater
