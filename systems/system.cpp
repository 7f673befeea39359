#include "tidewater/system.hpp"

#include <cmath>
#include <cstdio>

#include "makers.hpp"
#include "registry.hpp"
#include "system_impl.hpp"
#include "text_forms.hpp"

namespace tidewater {

namespace detail {

namespace {

bool plane(const Definition& definition) { return definition.method != 0; }

void need_size(const UnitDefinition& unit, const Definition& definition) {
  if (!std::isfinite(unit.factor) || !(unit.factor > 0)) {
    throw Error("The unit of " + definition.name + " has no size.");
  }
}

}  // namespace

SystemImpl::SystemImpl(Definition given)
    : definition(std::move(given)),
      projection(plane(definition) ? std::make_shared<const ProjectionImpl>(definition) : nullptr) {
  const bool vertical = definition.kind == SystemKind::vertical;
  if (vertical || definition.kind == SystemKind::compound) {
    need_size(definition.vertical_unit, definition);
  }
  if (vertical) return;
  const auto& ellipsoid = definition.datum.ellipsoid;
  // The constructor of an ellipsoid refuses what is none.
  (void)Ellipsoid(ellipsoid.a, ellipsoid.inverse_flattening);
  need_size(definition.unit, definition);
}

}  // namespace detail

namespace {

using detail::Definition;

std::shared_ptr<const detail::SystemImpl> made(std::string_view text,
                                               const std::optional<detail::Where>& where) {
  return std::make_shared<const detail::SystemImpl>(detail::definition_from_text(text, where));
}

std::string shown(double value) {
  char text[40];
  std::snprintf(text, sizeof text, "%.12g", value);
  // A locale may have its own decimal mark.
  for (char* c = text; *c != 0; ++c) {
    if (*c == ',') *c = '.';
  }
  return text;
}

}  // namespace

System::System(std::string_view text) : impl_(made(text, std::nullopt)) {}

System::System(std::string_view text, double longitude, double latitude)
    : impl_(made(text, detail::Where{longitude, latitude})) {}

std::string System::name() const { return impl_->definition.name; }
int System::code() const { return impl_->definition.code; }
SystemKind System::kind() const { return impl_->definition.kind; }

Ellipsoid System::ellipsoid() const {
  const auto& ellipsoid = impl_->definition.datum.ellipsoid;
  if (ellipsoid.code != 0) return Ellipsoid("EPSG:" + std::to_string(ellipsoid.code));
  return Ellipsoid(ellipsoid.a, ellipsoid.inverse_flattening);
}

std::string System::datum() const {
  const Definition& definition = impl_->definition;
  return definition.kind == SystemKind::vertical ? definition.vertical_datum
                                                 : definition.datum.name;
}

PrimeMeridian System::meridian() const {
  const auto& meridian = impl_->definition.datum.meridian;
  if (meridian.code != 0) return PrimeMeridian("EPSG:" + std::to_string(meridian.code));
  return PrimeMeridian(meridian.longitude * (180 / detail::kPi));
}

std::string System::unit() const {
  const Definition& definition = impl_->definition;
  return definition.kind == SystemKind::vertical ? definition.vertical_unit.name
                                                 : definition.unit.name;
}

double System::unit_factor() const {
  const Definition& definition = impl_->definition;
  return definition.kind == SystemKind::vertical ? definition.vertical_unit.factor
                                                 : definition.unit.factor;
}

std::string System::axes() const { return impl_->definition.axes; }

std::string System::method() const {
  return impl_->projection == nullptr ? "" : std::string(impl_->projection->method().name);
}

std::vector<std::pair<std::string, double>> System::parameters() const {
  const auto map = projection();
  return map ? map->parameters() : std::vector<std::pair<std::string, double>>{};
}

Area System::area() const {
  const Definition& definition = impl_->definition;
  return {definition.area, definition.west, definition.south, definition.east, definition.north};
}

std::optional<Projection> System::projection() const {
  if (impl_->projection == nullptr) return std::nullopt;
  return Projection(impl_->projection);
}

std::string System::to_proj() const { return detail::proj_from_definition(impl_->definition); }

std::string System::to_wkt() const {
  return detail::wkt_from_definition(impl_->definition, detail::Wkt::wkt2);
}

std::string System::to_wkt(std::string_view dialect) const {
  if (dialect == "wkt2") return to_wkt();
  if (dialect == "wkt1") return detail::wkt_from_definition(impl_->definition, detail::Wkt::wkt1);
  if (dialect == "esri") return detail::wkt_from_definition(impl_->definition, detail::Wkt::esri);
  throw Error("There is no dialect \"" + std::string(dialect) +
              "\" of WKT; there are \"wkt1\", \"esri\" and \"wkt2\".");
}

std::string System::describe() const {
  const Definition& definition = impl_->definition;
  static constexpr const char* kKinds[] = {"geographic, longitude and latitude",
                                           "geographic, longitude, latitude and height",
                                           "geocentric",
                                           "projected",
                                           "vertical",
                                           "compound"};
  std::string text = definition.name;
  if (definition.code != 0) text += " (EPSG:" + std::to_string(definition.code) + ")";
  text += "\nkind: " + std::string(kKinds[static_cast<int>(definition.kind)]);
  if (definition.kind != SystemKind::vertical) {
    text += "\ndatum: " + definition.datum.name;
    text += "\nellipsoid: " + definition.datum.ellipsoid.name +
            (definition.datum.ellipsoid.name.empty() ? "" : ", ") +
            "a = " + shown(definition.datum.ellipsoid.a) + " m";
    if (definition.datum.ellipsoid.inverse_flattening != 0) {
      text += ", 1/f = " + shown(definition.datum.ellipsoid.inverse_flattening);
    }
    text += "\nprime meridian: " + definition.datum.meridian.name;
    if (definition.datum.meridian.longitude != 0) {
      text += " " + shown(definition.datum.meridian.longitude * (180 / detail::kPi)) +
              " degrees east of Greenwich";
    }
  }
  if (impl_->projection != nullptr) {
    text += "\nmethod: " + method();
    for (const auto& [name, value] : parameters()) text += "\n  " + name + ": " + shown(value);
    text += "\nformulas: " + impl_->projection->truth();
  }
  if (!definition.vertical_name.empty()) {
    text += "\nheights: " + definition.vertical_name + " (" + definition.vertical_unit.name + ")";
  }
  text += "\nunit: " + unit() + "\naxes: " + definition.axes;
  if (!definition.area.empty()) {
    text += "\narea of use: " + definition.area + " (" + shown(definition.west) + " to " +
            shown(definition.east) + ", " + shown(definition.south) + " to " +
            shown(definition.north) + ")";
  }
  return text + "\n";
}

std::vector<FoundSystem> System::search(std::string_view words, std::size_t limit) {
  std::vector<FoundSystem> list;
  for (auto& found : detail::Registry::shared().search(words, limit)) {
    list.push_back({found.code, std::move(found.name), found.kind});
  }
  return list;
}

std::vector<FoundSystem> System::all() {
  const detail::Registry& registry = detail::Registry::shared();
  std::vector<FoundSystem> list;
  for (const int code : registry.systems()) {
    auto record = *registry.system(code);
    list.push_back({code, std::move(record.name), record.kind});
  }
  return list;
}

}  // namespace tidewater
