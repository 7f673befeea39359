// What the readers and writers of PROJ strings and WKT share.
#pragma once

#include <numbers>
#include <string>
#include <string_view>

#include "definition.hpp"
#include "methods.hpp"

namespace tidewater::detail {

inline constexpr double kDegreeInRadians = std::numbers::pi / 180;
inline constexpr double kGradInRadians = std::numbers::pi / 200;

// Small letters and digits alone: "Bonne_(South_Orientated)" and "Bonne South Orientated" are one.
std::string bare(std::string_view name);

// The shortest decimal text that is the number, with as few digits as 15 where they give it to
// within two units in the last place.
std::string number_text(double value);
std::string degrees_text(double radians);

// Whether two ellipsoids are one, as exactly as texts have them.
bool same_figures(const EllipsoidDefinition& a, const EllipsoidDefinition& b);

// The name of a datum of which the ellipsoid alone is known.
std::string unknown_datum(const EllipsoidDefinition& ellipsoid);

// Gives the definition all parameters that its method takes, at their usual value where none is
// given, in the method's order.
void complete_parameters(Definition& definition, const Method& method);

// The axes along which a method's formulas count, in their usual order.
std::string_view natural_axes(int method);

// Finds the datum, or the base system, in the registry by what the text calls it, so that the
// datum's code is known; leaves it as it is where the registry has none of that name with this
// ellipsoid and meridian, or where there is no registry.
void recognise_datum(Definition& definition);

// The method's parameter among these codes; 0 where it takes none of them.
int parameter_among(const Method& method, std::initializer_list<int> codes);

// As the method's formulas take it: the sentence names the system.
const Method& method_of(const Definition& definition);

}  // namespace tidewater::detail
