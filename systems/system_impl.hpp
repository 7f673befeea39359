// A coordinate system as it is known inside.
#pragma once

#include <memory>
#include <optional>
#include <string_view>

#include "definition.hpp"
#include "projection_impl.hpp"

namespace tidewater::detail {

class SystemImpl {
 public:
  // Throws an Error where the projection cannot be set up.
  explicit SystemImpl(Definition definition);

  const Definition definition;
  const std::shared_ptr<const ProjectionImpl> projection;  // null without one
};

// Definitions from the registry, throwing an Error that names what is missing.
Definition definition_from_registry(int code);
// Definitions from what users type; `longitude` and `latitude` in degrees serve "utm" and "ups".
struct Where {
  double longitude, latitude;
};
Definition definition_from_text(std::string_view text, const std::optional<Where>& where);

DatumDefinition datum_from_registry(int code);
EllipsoidDefinition ellipsoid_from_registry(int code);

}  // namespace tidewater::detail
