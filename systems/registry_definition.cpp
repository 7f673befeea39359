// Definitions from the registry's records.
#include <cmath>

#include "makers.hpp"
#include "registry.hpp"
#include "system_impl.hpp"

namespace tidewater::detail {

namespace {

[[noreturn]] void missing(const char* what, int code, const std::string& of) {
  throw Error("The registry has no " + std::string(what) + " " + std::to_string(code) + ", which " +
              of + " refers to.");
}

template <class T>
T need(std::optional<T> record, const char* what, int code, const std::string& of) {
  if (!record) missing(what, code, of);
  return *std::move(record);
}

}  // namespace

EllipsoidDefinition ellipsoid_from_registry(int code) {
  const auto record = need(Registry::shared().ellipsoid(code), "ellipsoid", code, "the definition");
  return {record.name, record.code, record.a, record.inverse_flattening};
}

DatumDefinition datum_from_registry(int code) {
  const Registry& registry = Registry::shared();
  const auto datum = need(registry.datum(code), "datum", code, "the definition");
  DatumDefinition result;
  result.name = datum.name;
  result.code = code;
  result.ellipsoid = ellipsoid_from_registry(datum.ellipsoid);
  const auto meridian =
      need(registry.meridian(datum.meridian), "prime meridian", datum.meridian, datum.name);
  result.meridian = {meridian.name, meridian.code, meridian.longitude};
  return result;
}

Definition definition_from_registry(int code) {
  const Registry& registry = Registry::shared();
  const auto system = registry.system(code);
  if (!system) {
    std::string sentence =
        "There is no coordinate system EPSG:" + std::to_string(code) + " in the registry";
    if (const auto withdrawn = registry.deprecated(code)) {
      sentence = "The registry has withdrawn EPSG:" + std::to_string(code) + ", " + withdrawn->name;
      if (withdrawn->replaced_by != 0) {
        sentence += "; EPSG:" + std::to_string(withdrawn->replaced_by) + " takes its place";
      }
    }
    throw Error(sentence + ".");
  }
  const std::string of = system->name;
  Definition result;
  if (system->kind == SystemKind::compound) {
    result = definition_from_registry(system->horizontal);
    const auto vertical = need(registry.system(system->vertical), "system", system->vertical, of);
    result.horizontal_code = system->horizontal;
    result.vertical_name = vertical.name;
    result.vertical_code = vertical.code;
    result.vertical_datum =
        need(registry.datum(vertical.datum), "datum", vertical.datum, vertical.name).name;
    const auto unit = need(registry.unit(vertical.unit), "unit", vertical.unit, of);
    result.vertical_unit = {unit.name, unit.code, unit.factor};
    result.axes += vertical.axes;
  } else if (system->kind == SystemKind::vertical) {
    const auto unit = need(registry.unit(system->unit), "unit", system->unit, of);
    result.vertical_name = system->name;
    result.vertical_code = code;
    result.vertical_datum = need(registry.datum(system->datum), "datum", system->datum, of).name;
    result.vertical_unit = {unit.name, unit.code, unit.factor};
    result.axes = system->axes;
  } else {
    result.datum = datum_from_registry(system->datum);
    const auto unit = need(registry.unit(system->unit), "unit", system->unit, of);
    result.unit = {unit.name, unit.code, unit.factor};
    // Sexagesimal digits have no factor; a plane in them has no size.
    if (unit.factor == 0 && system->kind != SystemKind::projected) {
      result.unit = {"degree", 9102, kPi / 180};
    }
    result.axes = system->axes;
    if (system->kind == SystemKind::projected) {
      const auto conversion =
          need(registry.conversion(system->conversion), "conversion", system->conversion, of);
      result.method = conversion.method;
      result.conversion = conversion.name;
      for (const auto& parameter : conversion.parameters) {
        result.parameters.push_back({parameter.code, registry.base_value(parameter)});
      }
      result.base_code = system->base;
      result.base = need(registry.system(system->base), "system", system->base, of).name;
    }
  }
  result.name = system->name;
  result.code = code;
  result.kind = system->kind;
  if (const auto area = registry.area(system->area)) {
    result.area = area->name;
    result.west = area->west;
    result.south = area->south;
    result.east = area->east;
    result.north = area->north;
  }
  return result;
}

}  // namespace tidewater::detail
