#include "angle_format.hpp"

#include <cstring>
#include <stdexcept>

namespace tidewater::command {

namespace {

constexpr double kDegree = 0.017453292519943295;

}  // namespace

AngleUnit AngleFormat::unit() const {
  AngleUnit unit = {};
  const char* text = "degree";
  int decimals = 9;
  unit.factor = kDegree;
  if (form == "grads") {
    text = "grad";
    unit.factor = kDegree * 0.9;
  } else if (form == "dms") {
    text = "d:m:s";
    decimals = 5;
    unit.factor = kDegree / 3600;  // one second
  } else if (form == "packed") {
    text = "dd.mmss";
    decimals = 5;
    unit.factor = kDegree / 3600;
  }
  std::strncpy(unit.format, text, sizeof unit.format - 1);
  unit.precision = static_cast<int16_t>(precision >= 0 ? precision : decimals);
  if (hemisphere != "sign" && reverse != "none") {
    throw std::invalid_argument("hemisphere letters and reversed axes exclude each other");
  }
  if (hemisphere == "front") {
    unit.hemisphere_mode = 4;
  } else if (hemisphere == "behind") {
    unit.hemisphere_mode = 5;
  } else if (reverse == "both") {
    unit.hemisphere_mode = 1;
  } else if (reverse == "lat") {
    unit.hemisphere_mode = 2;
  } else if (reverse == "lon") {
    unit.hemisphere_mode = 3;
  }
  return unit;
}

AngleFormat AngleFormat::without_hemisphere() const {
  AngleFormat plain = *this;
  plain.hemisphere = "sign";
  plain.reverse = "none";
  return plain;
}

void add_angle_options(CLI::App& app, AngleFormat& format, const std::string& prefix,
                       const std::string& group) {
  const auto add = [&](const std::string& name, std::string& value, const std::string& help,
                       const std::vector<std::string>& choices) {
    app.add_option("--" + prefix + name, value, help)
        ->check(CLI::IsMember(choices))
        ->capture_default_str()
        ->group(group);
  };
  add("format", format.form, "how an angle is written: 48.5, 53.9 grads, 48:30:00, or 48.3000",
      {"degrees", "grads", "dms", "packed"});
  add("hemisphere", format.hemisphere, "a sign, or a letter in front of or behind each angle",
      {"sign", "front", "behind"});
  add("reverse", format.reverse, "axes whose sign is turned round: lon is positive west",
      {"none", "both", "lat", "lon"});
  add("order", format.order, "which angle stands first", {"lat-lon", "lon-lat"});
}

}  // namespace tidewater::command
