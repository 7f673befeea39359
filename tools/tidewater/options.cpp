#include "options.hpp"

namespace tidewater::command {

void add_angle_options(CLI::App& app, AngleStyle& style, const std::string& prefix,
                       const std::string& group) {
  const auto add = [&](const std::string& name, std::string& value, const std::string& help,
                       const std::vector<std::string>& choices) {
    app.add_option("--" + prefix + name, value, help)
        ->check(CLI::IsMember(choices))
        ->capture_default_str()
        ->group(group);
  };
  if (prefix.empty()) {
    add("format", style.form,
        "how an angle is written: auto takes 48.5, 48:30:00N, N48 30.0, 48d30m00s and degree "
        "signs alike; packed is 48.3000",
        {"auto", "degrees", "grads", "dms", "packed"});
    add("hemisphere", style.hemisphere, "letters of the hemisphere: front and behind demand them",
        {"sign", "front", "behind"});
    app.add_option_function<std::string>(
           "--decimal",
           [&style](const std::string& mark) { style.decimal_comma = mark == "comma"; },
           "the decimal mark of the input")
        ->check(CLI::IsMember({"point", "comma"}))
        ->group(group);
  } else {
    style.form = "degrees";
    add("format", style.form,
        "how an angle is written: 48.5, 53.9 grads, 48:30.0, 48:30:00, 48.3000",
        {"degrees", "grads", "dm", "dms", "packed"});
    add("hemisphere", style.hemisphere, "a sign, or a letter in front of or behind each angle",
        {"sign", "front", "behind"});
  }
  add("reverse", style.reverse, "axes whose sign is turned round: lon is positive west",
      {"none", "both", "lat", "lon"});
  add("order", style.order, "which angle stands first", {"lat-lon", "lon-lat"});
}

void add_precision(CLI::App& app, int& precision, const std::string& help) {
  app.add_option("-p,--precision", precision, help)
      ->check(CLI::Range(0, kMostDecimals))
      ->group("Output");
}

}  // namespace tidewater::command
