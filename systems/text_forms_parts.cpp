#include "text_forms_parts.hpp"

#include <charconv>
#include <cmath>

#include "makers.hpp"
#include "registry.hpp"
#include "system_impl.hpp"

namespace tidewater::detail {

std::string bare(std::string_view name) {
  std::string result;
  for (const char c : name) {
    if (c >= 'A' && c <= 'Z') result += static_cast<char>(c + 32);
    if ((c >= 'a' && c <= 'z') || (c >= '0' && c <= '9')) result += c;
  }
  return result;
}

std::string number_text(double value) {
  char text[40];
  auto end = std::to_chars(text, text + sizeof text, value, std::chars_format::general, 15).ptr;
  double back = 0;
  std::from_chars(text, end, back);
  if (std::fabs(back - value) > 0x1p-51 * std::fabs(value)) {
    end = std::to_chars(text, text + sizeof text, value).ptr;
  }
  return {text, end};
}

std::string degrees_text(double radians) { return number_text(radians / kDegreeInRadians); }

std::string unknown_datum(const EllipsoidDefinition& ellipsoid) {
  const std::string_view name = ellipsoid.name;
  return "unknown datum on " + std::string(name.empty() ? "an ellipsoid" : name);
}

void complete_parameters(Definition& definition, const Method& method) {
  std::vector<ParameterValue> complete;
  for (const MethodParameter& parameter : method.parameters) {
    const double usual = parameter_kind(parameter.code)->usual;
    complete.push_back({parameter.code, definition.parameter(parameter.code, usual)});
  }
  definition.parameters = std::move(complete);
}

std::string_view natural_axes(int method) {
  switch (method) {
    case 9808:
    case 9828:
      return "WS";
    case 9819:
    case 1042:
      return "SW";
    case 9826:
      return "WN";
    default:
      return "EN";
  }
}

bool same_figures(const EllipsoidDefinition& a, const EllipsoidDefinition& b) {
  // Texts round the flattening, and name a sphere by zero or by infinity.
  return std::fabs(a.a - b.a) <= 1e-9 * b.a &&
         std::fabs(a.inverse_flattening - b.inverse_flattening) <=
             1e-7 * (1 + b.inverse_flattening);
}

void recognise_datum(Definition& definition) {
  DatumDefinition& datum = definition.datum;
  try {
    const Registry& registry = Registry::shared();
    const auto take = [&](int code) {
      const auto record = registry.datum(code);
      if (!record || record->ellipsoid == 0) return false;  // none, or one of heights
      DatumDefinition known = datum_from_registry(code);
      if (!same_figures(datum.ellipsoid, known.ellipsoid) ||
          !(std::fabs(datum.meridian.longitude - known.meridian.longitude) < 1e-9)) {
        return false;
      }
      known.to_wgs84 = datum.to_wgs84;
      datum = std::move(known);
      return true;
    };
    if (take(datum.code)) return;
    datum.code = 0;
    for (const int code : {definition.base_code, definition.code, definition.horizontal_code}) {
      if (const auto system = registry.system(code); system && take(system->datum)) return;
    }
    const auto take_named = [&](std::string_view name) {
      const auto known = registry.datum(name);
      return known && take(known->code);
    };
    const std::string_view name = datum.name;
    if (take_named(name)) return;
    // The dialect of .prj files.
    if ((name.starts_with("D_") || name.starts_with("d_")) && take_named(name.substr(2))) return;
    std::string_view base = definition.base;
    if (base.starts_with("GCS_")) base.remove_prefix(4);
    if (const auto known = registry.system(base)) take(known->datum);
  } catch (const Error&) {
    // Without a registry the text alone speaks.
  }
}

int parameter_among(const Method& method, std::initializer_list<int> codes) {
  for (const MethodParameter& parameter : method.parameters) {
    for (const int code : codes) {
      if (parameter.code == code) return code;
    }
  }
  return 0;
}

const Method& method_of(const Definition& definition) {
  const Method* method = method_by_code(definition.method);
  if (method == nullptr) {
    throw Error("The projection method of " + definition.name + " (" +
                std::to_string(definition.method) + ") has no form as text.");
  }
  return *method;
}

}  // namespace tidewater::detail
