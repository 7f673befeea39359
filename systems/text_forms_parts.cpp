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

void complete_parameters(Definition& definition, const Method& method) {
  std::vector<ParameterValue> complete;
  for (const MethodParameter& parameter : method.parameters) {
    const double usual = parameter_kind(parameter.code)->usual;
    complete.push_back({parameter.code, definition.parameter(parameter.code, usual)});
  }
  definition.parameters = std::move(complete);
}

namespace {

bool same_figures(const DatumDefinition& a, const DatumDefinition& b) {
  const auto near = [](double x, double y) { return std::fabs(x - y) <= 1e-9 * std::fabs(y); };
  // Texts round the flattening, and name a sphere by zero or by infinity.
  return near(a.ellipsoid.a, b.ellipsoid.a) &&
         std::fabs(a.ellipsoid.inverse_flattening - b.ellipsoid.inverse_flattening) <=
             1e-7 * (1 + b.ellipsoid.inverse_flattening) &&
         std::fabs(a.meridian.longitude - b.meridian.longitude) < 1e-9;
}

}  // namespace

void recognise_datum(Definition& definition) {
  DatumDefinition& datum = definition.datum;
  try {
    const Registry& registry = Registry::shared();
    const auto take = [&](int code) {
      const auto record = registry.datum(code);
      if (!record || record->ellipsoid == 0) return false;  // none, or one of heights
      DatumDefinition known = datum_from_registry(code);
      if (!same_figures(datum, known)) return false;
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

bool horizontal_axes(std::string_view axes) {
  if (axes.size() < 2 || axes.size() > 3) return false;
  const auto along = [&](std::string_view letters) {
    return letters.find(axes[0]) != letters.npos || letters.find(axes[1]) != letters.npos;
  };
  return along("EW") && along("NS") && (axes.size() == 2 || axes[2] == 'U');
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
