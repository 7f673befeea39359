// Small readers of the texts that users type.
#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace tidewater::detail {

std::string_view trimmed(std::string_view text);

// "EPSG:2154", "epsg::2154", "urn:ogc:def:crs:EPSG::2154" or digits alone.
std::optional<int> registry_code(std::string_view text);

// A whole text as a number in the notation of programs, whatever the locale.
std::optional<double> number(std::string_view text);

// Whether these letters are one axis to the east or west and one to the north or south, in either
// order, and perhaps a third upwards.
bool horizontal_axes(std::string_view axes);

// Words parted by blanks; quotation marks keep blanks in a word.
std::vector<std::string> words_of(std::string_view text);

}  // namespace tidewater::detail
