#include "ellipsoid.hpp"

#include <cctype>
#include <cmath>
#include <stdexcept>

namespace tidewater::command {

namespace {

struct Named {
  const char* name;
  double a;
  double rf;
};

// Defining constants as published: semi-major axis in metres and inverse flattening, the latter
// worked out from the semi-minor axis where that is what defines the ellipsoid. EPSG dataset;
// Snyder 1987, p. 12; IGN, Clarke 1880 (a = 6378249.2, b = 6356515).
constexpr Named kEllipsoids[] = {
    {"GRS 80", 6378137, 298.257222101},
    {"WGS 84", 6378137, 298.257223563},
    {"WGS 72", 6378135, 298.26},
    {"GRS 67", 6378160, 298.247167427},
    {"Clarke 1866", 6378206.4, 6378206.4 / (6378206.4 - 6356583.8)},
    {"Clarke 1880 IGN", 6378249.2, 6378249.2 / (6378249.2 - 6356515.0)},
    {"Clarke 1880 RGS", 6378249.145, 293.465},
    {"Bessel 1841", 6377397.155, 299.1528128},
    {"International 1924", 6378388, 297},
    {"Krassowsky 1940", 6378245, 298.3},
    {"Airy 1830", 6377563.396, 299.3249646},
    {"Airy Modified 1849", 6377340.189, 299.3249646},
    {"Everest 1830", 6377276.345, 300.8017},
    {"Australian National", 6378160, 298.25},
    {"Helmert 1906", 6378200, 298.3},
    {"Sphere", 6370997, 0},
};

// Other names that people give to the same ellipsoid.
struct Alias {
  const char* name;
  const char* of;
};
constexpr Alias kAliases[] = {
    {"Airy", "Airy 1830"},
    {"Everest", "Everest 1830"},
    {"Bessel", "Bessel 1841"},
    {"Hayford", "International 1924"},
    {"International", "International 1924"},
    {"Krassovsky", "Krassowsky 1940"},
};

std::string key(const std::string& text) {
  std::string k;
  for (const unsigned char c : text) {
    if (std::isalnum(c)) k += static_cast<char>(std::tolower(c));
  }
  return k;
}

}  // namespace

double Ellipsoid::e() const { return std::sqrt(f * (2 - f)); }

Ellipsoid find_ellipsoid(const std::string& text) {
  std::string wanted = key(text);
  for (const Alias& alias : kAliases) {
    if (key(alias.name) == wanted) wanted = key(alias.of);
  }
  for (const Named& known : kEllipsoids) {
    if (key(known.name) == wanted) return {known.a, known.rf == 0 ? 0 : 1 / known.rf};
  }
  const std::size_t comma = text.find(',');
  if (comma != std::string::npos) {
    try {
      std::size_t end_a = 0, end_rf = 0;
      const std::string second = text.substr(comma + 1);
      const double a = std::stod(text, &end_a);
      const double rf = std::stod(second, &end_rf);
      const bool whole = end_a == comma && end_rf == second.size();
      // an inverse flattening of one or less would have no semi-minor axis
      if (whole && std::isfinite(a) && a > 0 && (rf == 0 || (std::isfinite(rf) && rf > 1))) {
        return {a, rf == 0 ? 0 : 1 / rf};
      }
    } catch (const std::logic_error&) {
      // said below
    }
  }
  throw std::invalid_argument("no such ellipsoid: " + text + " (known: " + ellipsoid_names() +
                              "; or A,RF)");
}

std::string ellipsoid_names() {
  std::string names;
  for (const Named& known : kEllipsoids) {
    if (!names.empty()) names += ", ";
    names += known.name;
  }
  return names;
}

}  // namespace tidewater::command
