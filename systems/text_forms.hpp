// Definitions as the texts that users have in their files.
#pragma once

#include <string>
#include <string_view>

#include "definition.hpp"

namespace tidewater::detail {

// WKT in its dialects.
enum class Wkt { wkt1, esri, wkt2 };

// Errors are sentences that name what was asked and what there is.
Definition definition_from_proj(std::string_view text);
Definition definition_from_wkt(std::string_view text);
std::string proj_from_definition(const Definition& definition);
std::string wkt_from_definition(const Definition& definition, Wkt version);

}  // namespace tidewater::detail
