// Definitions from WKT: version 1 as it is commonly written, the dialect of .prj files, and
// version 2 of 2015 and 2019 (ISO 19162, OGC 18-010).

#include <algorithm>
#include <cmath>
#include <iterator>

#include "makers.hpp"
#include "text_forms.hpp"
#include "text_forms_parts.hpp"
#include "wkt_text.hpp"
#include "words.hpp"

namespace tidewater::detail {

namespace {

std::string place(const WktNode& node) { return ", at character " + std::to_string(node.at); }

[[noreturn]] void refuse(const WktNode& node, const std::string& what) {
  throw Error("The WKT's " + node.value + " " + what + place(node) + ".");
}

const WktNode& need(const WktNode& node, std::string_view keyword, std::string_view second = {},
                    std::string_view third = {}, std::string_view fourth = {}) {
  const WktNode* found = node.find(keyword, second, third, fourth);
  if (found == nullptr) refuse(node, "has no " + std::string(keyword));
  return *found;
}

double need_figure(const WktNode& node, std::size_t at) {
  const double value = node.figure(at, std::nan(""));
  if (std::isnan(value)) refuse(node, "lacks a number");
  return value;
}

// As a number in version 2, as a text in version 1; 0 where it is none of the registry's.
int code_of(const WktNode& node) {
  const WktNode* id = node.find("ID", "AUTHORITY");
  if (id == nullptr || id->children.size() < 2 || bare(id->text(0)) != "epsg") return 0;
  return registry_code(id->children[1].value).value_or(0);
}

// A unit's factor as the text rounds it, to what it stands for.
double exact_factor(double factor) {
  for (const double known : {kDegreeInRadians, kGradInRadians, 1200.0 / 3937.0}) {
    if (std::fabs(factor - known) < 1e-11 * known) return known;
  }
  return factor;
}

UnitDefinition read_unit(const WktNode& node) {
  UnitDefinition unit;
  unit.name = node.text(0);
  unit.code = code_of(node);
  unit.factor = exact_factor(need_figure(node, 1));
  if (!(unit.factor > 0)) refuse(node, "is not above zero");
  return unit;
}

UnitDefinition read_length_unit(const WktNode& node) {
  UnitDefinition unit = read_unit(node);
  // Version 1 has one keyword for both.
  if (unit.factor == kDegreeInRadians || unit.factor == kGradInRadians ||
      bare(unit.name) == "radian") {
    refuse(node, "is a unit of angle where a length is needed");
  }
  return unit;
}

double factor_of(const WktNode* unit, double otherwise) {
  return unit != nullptr ? read_unit(*unit).factor : otherwise;
}

const WktNode* any_unit(const WktNode& node) {
  return node.find("ANGLEUNIT", "LENGTHUNIT", "SCALEUNIT", "UNIT");
}

EllipsoidDefinition read_ellipsoid(const WktNode& node) {
  EllipsoidDefinition ellipsoid;
  ellipsoid.name = node.text(0);
  ellipsoid.code = code_of(node);
  ellipsoid.a = need_figure(node, 1) * factor_of(any_unit(node), 1);
  ellipsoid.inverse_flattening = need_figure(node, 2);
  if (!(ellipsoid.a > 0) || !std::isfinite(ellipsoid.a)) {
    refuse(node, "has a semi-major axis that is no length above zero");
  }
  if (ellipsoid.inverse_flattening != 0 && !(ellipsoid.inverse_flattening >= 3)) {
    refuse(node, "has an inverse flattening below 3");
  }
  return ellipsoid;
}

// The factor is that of the system's angles.
MeridianDefinition read_meridian(const WktNode& node, bool first_version, double factor) {
  MeridianDefinition meridian;
  meridian.name = node.text(0);
  meridian.code = code_of(node);
  const double value = need_figure(node, 1);
  // Version 1 has the unit of its system, its writers have degrees; Paris tells which.
  if (first_version) {
    factor = std::fabs(value - 2.5969213) < 1e-6 ? kGradInRadians : kDegreeInRadians;
  }
  meridian.longitude = value * factor_of(any_unit(node), factor);
  if (!(std::fabs(meridian.longitude) <= 2 * kPi)) refuse(node, "is beyond a whole turn");
  return meridian;
}

// TOWGS84 of version 1.
void read_shift(const WktNode& node, DatumDefinition& datum) {
  if (node.children.size() != 3 && node.children.size() != 7) {
    refuse(node, "has neither three nor seven numbers");
  }
  datum.to_wgs84.emplace();
  for (std::size_t i = 0; i < node.children.size(); ++i) {
    (*datum.to_wgs84)[i] = need_figure(node, i);
  }
}

// Datum, ellipsoid and prime meridian of a geographic or geocentric system.
void read_datum(const WktNode& system, bool first_version, Definition& definition) {
  const WktNode& datum =
      need(system, "DATUM", "ENSEMBLE", "GEODETICDATUM", first_version ? "" : "TRF");
  definition.datum.name = datum.text(0);
  definition.datum.code = code_of(datum);
  definition.datum.ellipsoid = read_ellipsoid(need(datum, "ELLIPSOID", "SPHEROID"));
  if (const WktNode* shift = datum.find("TOWGS84")) read_shift(*shift, definition.datum);
  if (const WktNode* meridian = system.find("PRIMEM", "PRIMEMERIDIAN")) {
    const WktNode* angle = system.find("ANGLEUNIT");
    if (const WktNode* axis = system.find("AXIS"); angle == nullptr && axis != nullptr) {
      angle = axis->find("ANGLEUNIT");
    }
    definition.datum.meridian =
        read_meridian(*meridian, first_version, factor_of(angle, kDegreeInRadians));
  }
}

// --- axes ----------------------------------------------------------------------------------------

char letter_of(const std::string& direction) {
  const std::string word = bare(direction);
  if (word == "east") return 'E';
  if (word == "north") return 'N';
  if (word == "west") return 'W';
  if (word == "south") return 'S';
  if (word == "up") return 'U';
  if (word == "down") return 'D';
  return '\0';
}

// In the order that the text numbers, else in its own; empty where it has none.
std::string read_axes(const WktNode& system) {
  struct Axis {
    double order;
    char letter;
    char by_name;
  };
  std::vector<Axis> given;
  for (const WktNode& child : system.children) {
    if (!child.is("AXIS")) continue;
    const char letter = child.children.size() < 2 ? '\0' : letter_of(child.children[1].value);
    if (letter == '\0') refuse(child, "has no direction that is known here");
    const std::string name = bare(child.text(0));
    const bool northing = name.starts_with("north") || name == "n" || name == "y";
    const WktNode* order = child.find("ORDER");
    given.push_back({order != nullptr ? need_figure(*order, 0) : 0, letter, northing ? 'N' : 'E'});
  }
  std::stable_sort(given.begin(), given.end(),
                   [](const Axis& a, const Axis& b) { return a.order < b.order; });
  std::string axes, by_names;
  for (const Axis& axis : given) {
    axes += axis.letter;
    by_names += axis.by_name;
  }
  // At a pole both point the same way: their names tell.
  const auto polar = [](char letter) { return letter == 'N' || letter == 'S'; };
  if (axes.size() >= 2 && axes[0] == axes[1] && polar(axes[0])) {
    if (by_names[0] == by_names[1]) by_names = "EN";
    axes.replace(0, 2, by_names, 0, 2);
  }
  return axes;
}

std::string read_horizontal_axes(const WktNode& system) {
  std::string axes = read_axes(system);
  if (!axes.empty() && !horizontal_axes(axes)) {
    refuse(system,
           "has axes that are not one along the parallel, one along the meridian and perhaps one "
           "upwards");
  }
  return axes;
}

// --- methods -------------------------------------------------------------------------------------

// Names in texts that are none of the table's.
struct MethodAlias {
  std::string_view name;
  int code;
};
constexpr MethodAlias kMethodAliases[] = {
    {"gausskruger", 9807},
    {"transversemercatorcomplex", 9807},
    {"igacplanocartesiano", 1052},
    {"tunisiamappinggrid", 9816},
    {"tunisiamininggrid", 9816},
    {"behrmann", 9835},
    {"platecarree", 1029},
    {"equirectangular", 1028},
    {"equidistantcylindrical", 1028},
    {"mercatorauxiliarysphere", 1024},
    {"popularvisualisationpseudomercator", 1024},
    {"rectifiedskeworthomorphiccenter", 9815},
    {"rectifiedskeworthomorphicnaturalorigin", 9812},
    {"hotineobliquemercatorazimuthnaturalorigin", 9812},
    {"obliquemercator", 9815},
    {"stereographicnorthpole", 9829},
    {"stereographicsouthpole", 9829},
    {"polarstereographic", 9829},
    {"lambertconformalconic", 9802},
    {"lambertazimuthalequalarea", 9820},
    {"cylindricalequalarea", 9835},
    {"lambertcylindricalequalarea", 9835},
    {"azimuthalequidistant", kAzimuthalEquidistant},
    {"mercator", 9805},
    {"krovak", 9819},
    {"nearsideperspective", 9838},
    {"verticalnearsideperspective", 9838},
    {"vandergrinten", kVanDerGrinten},
    {"vandergrinteni", kVanDerGrinten},
};

bool is_called(std::string_view name, const std::string& wanted) { return bare(name) == wanted; }

const Method& find_method(const WktNode& node) {
  if (const Method* method = method_by_code(code_of(node))) return *method;
  const std::string name = bare(node.text(0));
  if (name.empty()) refuse(node, "has no name");
  for (const MethodAlias& alias : kMethodAliases) {
    if (alias.name == name) return *method_by_code(alias.code);
  }
  for (const Method& method : methods()) {
    if (is_called(method.name, name) || is_called(method.wkt1, name)) return method;
  }
  for (const Method& method : methods()) {
    if (is_called(method.esri, name)) return method;
  }
  if (const Method* method = method_by_words(node.text(0))) return *method;
  refuse(node, "names the projection method \"" + node.text(0).substr(0, 80) +
                   "\", which is not among those that are known here");
}

struct Given {
  const WktNode* node;
  std::string name;  // bare
  int code;          // by its identifier, 0 without one
  double value;
  const WktNode* unit;
};

// Which of the table's parameters a name stands for, by what it is about.
int code_by_name(const Method& method, const Given& given) {
  if (given.code != 0 && parameter_among(method, {given.code}) != 0) return given.code;
  for (const MethodParameter& parameter : method.parameters) {
    const ParameterKind& kind = *parameter_kind(parameter.code);
    if (is_called(kind.name, given.name) || is_called(parameter.wkt1, given.name)) {
      return parameter.code;
    }
  }
  struct Group {
    std::initializer_list<std::string_view> names;
    std::initializer_list<int> codes;
  };
  static const Group kGroups[] = {
      {{"latitudeoforigin", "latitudeofcenter", "latitudeofcentre", "latitudeofnaturalorigin",
        "latitudeoffalseorigin", "latitudeofprojectioncentre", "centralparallel"},
       {kLat0, kLatC, kLatF, kTopoLat}},
      {{"centralmeridian", "longitudeofcenter", "longitudeofcentre", "longitudeoforigin",
        "longitudeofnaturalorigin", "longitudeoffalseorigin", "longitudeofprojectioncentre"},
       {kLon0, kLonC, kLonF, kLonOrigin, kTopoLon}},
      {{"standardparallel1", "latitudeof1ststandardparallel", "latitudeofstandardparallel"},
       {kLat1, kLatTrue}},
      {{"scalefactor", "scalefactoratnaturalorigin", "scalefactoroninitialline"},
       {kK0, kLineScale, kPseudoScale, kEllipsoidScaling}},
      {{"falseeasting", "eastingatfalseorigin", "eastingatprojectioncentre"}, {kX0, kXC, kXF}},
      {{"falsenorthing", "northingatfalseorigin", "northingatprojectioncentre"}, {kY0, kYC, kYF}},
      {{"azimuth"}, {kAzimuth, kColatitude}},
      {{"rectifiedgridangle", "xyplanerotation"}, {kRectifiedAngle}},
      {{"height"}, {kViewHeight, kPlaneHeight}},
      {{"pseudostandardparallel1"}, {kPseudoParallel}},
  };
  for (const Group& group : kGroups) {
    for (const auto name : group.names) {
      if (name != given.name) continue;
      for (const int code : group.codes) {
        if (parameter_among(method, {code}) != 0) return code;
      }
    }
  }
  return 0;
}

const Given* find(const std::vector<Given>& given, std::initializer_list<std::string_view> names) {
  for (const auto name : names) {
    for (const Given& one : given) {
      if (one.name == name) return &one;
    }
  }
  return nullptr;
}

// Names that stand for several methods: what is given beside them tells.
const Method& variant(const WktNode& name, const Method& method, std::vector<Given>& given,
                      const std::string& axes, const UnitDefinition& angle, bool by_code) {
  if (by_code) return method;
  const std::string word = bare(name.text(0));
  const auto code = [](int wanted) -> const Method& { return *method_by_code(wanted); };
  const auto drop = [&](std::initializer_list<std::string_view> names) {
    while (const Given* found = find(given, names))
      given.erase(given.begin() + (found - &given[0]));
  };
  const auto degrees_of = [&](const Given* one) {
    if (one == nullptr) return 0.0;
    return one->value * (factor_of(one->unit, angle.factor) / kDegreeInRadians);
  };
  const double lat0 = degrees_of(find(given, {"latitudeoforigin", "latitudeofcenter"}));
  const Given* first = find(given, {"standardparallel1"});
  if (word == "lambertconformalconic") {
    const Given* scale = find(given, {"scalefactor"});
    if (find(given, {"standardparallel2"}) != nullptr) {
      return code(scale == nullptr || scale->value == 1 ? 9802 : 1051);
    }
    if (first != nullptr && std::fabs(degrees_of(first) - lat0) > 1e-10) return code(1102);
    drop({"standardparallel1"});
    return code(9801);
  }
  if (word == "mercator" && first == nullptr && find(given, {"scalefactor"}) != nullptr) {
    return code(9804);
  }
  if (word == "polarstereographic" || word == "stereographicnorthpole" ||
      word == "stereographicsouthpole" || word == "stereographic") {
    const double pole = std::fabs(lat0 != 0 ? lat0 : degrees_of(first));
    const bool scaled = find(given, {"scalefactor"}) != nullptr;
    if (word == "stereographic" && std::fabs(pole - 90) > 1e-9) return method;
    if (std::fabs(pole - 90) < 1e-9 && scaled) {
      if (lat0 == 0) {  // the parallel is the pole
        given[static_cast<std::size_t>(first - &given[0])].name = "latitudeoforigin";
      }
      return code(9810);
    }
    for (Given& one : given) {
      if (one.name == "latitudeoforigin" && first == nullptr) one.name = "standardparallel1";
    }
    if (first != nullptr) drop({"latitudeoforigin"});
    return code(9829);
  }
  if (word == "krovak") {
    const double rotation = degrees_of(find(given, {"xyplanerotation"}));
    const bool turned = std::fabs(rotation - 90) < 1e-9 || axes == "EN";
    drop({"xscale", "yscale", "xyplanerotation"});
    return code(turned ? 1041 : 9819);
  }
  if (word == "mercatorauxiliarysphere") drop({"standardparallel1", "auxiliaryspheretype"});
  if (method.code == 9815 || method.code == 9812) {
    // Without an angle of its own the grid is rectified by the azimuth.
    const Given* azimuth = find(given, {"azimuth"});
    if (azimuth != nullptr && find(given, {"rectifiedgridangle", "xyplanerotation"}) == nullptr) {
      Given rotation = *azimuth;
      rotation.name = "rectifiedgridangle";
      given.push_back(rotation);
    }
  }
  return method;
}

void read_parameters(const WktNode& owner, const WktNode& name, const UnitDefinition& angle,
                     const UnitDefinition& length, const std::string& axes,
                     Definition& definition) {
  std::vector<Given> given;
  for (const WktNode& child : owner.children) {
    if (!child.is("PARAMETER")) continue;
    if (child.text(0).empty()) refuse(child, "has no name");
    given.push_back(
        {&child, bare(child.text(0)), code_of(child), need_figure(child, 1), any_unit(child)});
  }
  const Method& named = find_method(name);
  const bool by_code = code_of(name) == named.code || is_called(named.name, bare(name.text(0)));
  const bool second_version = name.value == "METHOD";
  const Method& method = variant(name, named, given, axes, angle, by_code && second_version);
  definition.method = method.code;
  for (const Given& one : given) {
    const int code = code_by_name(method, one);
    if (code == 0) {
      // What changes nothing is let pass.
      const bool scale = one.name.find("scale") != std::string::npos;
      if (one.value == (scale ? 1 : 0)) continue;
      refuse(*one.node, "\"" + one.node->text(0).substr(0, 80) +
                            "\" is not taken by the projection method " + std::string(method.name));
    }
    double factor = 1;
    switch (parameter_kind(code)->quantity) {
      case Quantity::angle:
        factor = angle.factor;
        break;
      case Quantity::length:
        factor = length.factor;
        break;
      case Quantity::scale:
        break;
    }
    const double value = one.value * factor_of(one.unit, factor);
    if (!std::isfinite(value)) refuse(*one.node, "is out of range");
    if (definition.parameter(code, value) != value) {
      refuse(*one.node, "\"" + one.node->text(0).substr(0, 80) + "\" has two different values");
    }
    definition.parameters.push_back({code, value});
  }
  complete_parameters(definition, method);
}

// --- systems -------------------------------------------------------------------------------------

void read_area(const WktNode& system, Definition& definition) {
  const WktNode* usage = system.find("USAGE");
  const WktNode& owner = usage != nullptr ? *usage : system;
  if (const WktNode* area = owner.find("AREA")) definition.area = area->text(0);
  if (const WktNode* box = owner.find("BBOX")) {
    definition.south = need_figure(*box, 0);
    definition.west = need_figure(*box, 1);
    definition.north = need_figure(*box, 2);
    definition.east = need_figure(*box, 3);
    const auto within = [](double degrees, double limit) { return std::fabs(degrees) <= limit; };
    if (!within(definition.south, 90) || !within(definition.north, 90) ||
        !within(definition.west, 180) || !within(definition.east, 180)) {
      refuse(*box, "has a side that is not on the earth");
    }
    if (definition.area.empty()) definition.area = "as given";
  }
}

bool is_geographic(const WktNode& node) {
  return node.is("GEOGCS") || node.is("GEOGCRS") || node.is("GEOGRAPHICCRS") ||
         node.is("GEODCRS") || node.is("GEODETICCRS") || node.is("GEOCCS");
}
bool is_projected(const WktNode& node) {
  return node.is("PROJCS") || node.is("PROJCRS") || node.is("PROJECTEDCRS");
}
bool is_vertical(const WktNode& node) {
  return node.is("VERT_CS") || node.is("VERTCS") || node.is("VERTCRS") || node.is("VERTICALCRS");
}

// Of the system, or of its first axis, where version 2 may have it; null without one.
const WktNode* unit_of(const WktNode& node, std::string_view keyword) {
  if (const WktNode* unit = node.find(keyword, "UNIT")) return unit;
  const WktNode* axis = node.find("AXIS");
  return axis != nullptr ? axis->find(keyword, "UNIT") : nullptr;
}

UnitDefinition length_unit_of(const WktNode& node) {
  const WktNode* unit = unit_of(node, "LENGTHUNIT");
  return unit != nullptr ? read_length_unit(*unit) : UnitDefinition{"metre", 9001, 1};
}

Definition read_geographic(const WktNode& node) {
  Definition definition;
  const bool first_version = node.is("GEOGCS") || node.is("GEOCCS");
  definition.name = node.text(0);
  definition.code = code_of(node);
  read_datum(node, first_version, definition);
  const WktNode* kind = node.find("CS");
  const bool cartesian =
      kind != nullptr && !kind->children.empty() && is_called(kind->children[0].value, "cartesian");
  if (node.is("GEOCCS") || cartesian) {
    definition.kind = SystemKind::geocentric;
    definition.unit = length_unit_of(node);
    definition.axes = "XYZ";
  } else {
    const WktNode* unit = unit_of(node, "ANGLEUNIT");
    definition.axes = read_horizontal_axes(node);
    const bool height = (kind != nullptr && kind->figure(1, 2) == 3) ||
                        definition.axes.size() == 3 || node.find("LINUNIT") != nullptr;
    definition.kind = height ? SystemKind::geographic3d : SystemKind::geographic2d;
    definition.unit =
        unit != nullptr ? read_unit(*unit) : UnitDefinition{"degree", 9102, kDegreeInRadians};
    if (definition.axes.empty()) definition.axes = "EN";
    if (height && definition.axes.size() == 2) definition.axes += 'U';
  }
  read_area(node, definition);
  recognise_datum(definition);
  return definition;
}

Definition read_projected(const WktNode& node) {
  Definition definition;
  const bool first_version = node.is("PROJCS");
  definition.kind = SystemKind::projected;
  definition.name = node.text(0);
  definition.code = code_of(node);
  const WktNode& base = first_version
                            ? need(node, "GEOGCS")
                            : need(node, "BASEGEOGCRS", "BASEGEODCRS", "BASEGEOGRAPHICCRS");
  read_datum(base, first_version, definition);
  definition.base = base.text(0);
  definition.base_code = code_of(base);

  definition.axes = read_horizontal_axes(node);
  definition.unit = length_unit_of(node);

  UnitDefinition angle{"degree", 9102, kDegreeInRadians};
  if (const WktNode* given = base.find("ANGLEUNIT", "UNIT")) angle = read_unit(*given);
  if (first_version) {
    const WktNode& method = need(node, "PROJECTION");
    read_parameters(node, method, angle, definition.unit, definition.axes, definition);
    // The pseudo-Mercator of web maps has no name of its own in version 1.
    const WktNode* extension = node.find("EXTENSION");
    const std::string proj = extension != nullptr ? extension->text(1) : std::string();
    if (definition.method == 9804 &&
        (definition.code == 3857 || proj.find("nadgrids=@null") != std::string::npos)) {
      definition.method = 1024;
      complete_parameters(definition, *method_by_code(1024));
    }
  } else {
    const WktNode& conversion = need(node, "CONVERSION");
    definition.conversion = conversion.text(0);
    read_parameters(conversion, need(conversion, "METHOD", "PROJECTION"), angle, definition.unit,
                    definition.axes, definition);
  }
  if (definition.axes.empty()) definition.axes = natural_axes(definition.method);
  read_area(node, definition);
  recognise_datum(definition);
  return definition;
}

void read_vertical(const WktNode& node, Definition& definition) {
  definition.vertical_name = node.text(0);
  definition.vertical_code = code_of(node);
  if (const WktNode* datum = node.find("VDATUM", "VERT_DATUM", "VERTICALDATUM", "ENSEMBLE")) {
    definition.vertical_datum = datum->text(0);
  }
  definition.vertical_unit = length_unit_of(node);
  std::string axes = read_axes(node);
  if (axes.empty()) axes = "U";
  if (axes != "U" && axes != "D") refuse(node, "has an axis that points neither up nor down");
  // The dialect of .prj files has parameters in place of an axis.
  for (const WktNode& child : node.children) {
    if (!child.is("PARAMETER")) continue;
    const std::string name = bare(child.text(0));
    const double value = need_figure(child, 1);
    if (name == "direction" && std::fabs(value) == 1) {
      axes = value < 0 ? "D" : "U";
    } else if (name != "verticalshift" || value != 0) {
      refuse(child, "\"" + child.text(0).substr(0, 80) + "\" has a value that is not known here");
    }
  }
  definition.axes += axes;
}

// Heights above another surface can stand beside two axes alone.
void refuse_as_horizontal_part(const Definition& definition, const WktNode& node) {
  if (definition.kind != SystemKind::projected && definition.kind != SystemKind::geographic2d) {
    refuse(node, "has neither a map's nor a geographic system's two axes beside its heights");
  }
}

Definition read_system(const WktNode& node);

Definition read_compound(const WktNode& node) {
  const WktNode* horizontal = nullptr;
  const WktNode* vertical = nullptr;
  for (const WktNode& child : node.children) {
    const WktNode** part = nullptr;
    if (is_vertical(child)) {
      part = &vertical;
    } else if (is_projected(child) || is_geographic(child) || child.is("BOUNDCRS")) {
      part = &horizontal;
    } else {
      continue;
    }
    if (*part != nullptr) refuse(node, "has two horizontal or two vertical systems");
    *part = &child;
  }
  if (horizontal == nullptr || vertical == nullptr) {
    refuse(node, "has no horizontal or no vertical system");
  }
  Definition definition = read_system(*horizontal);
  refuse_as_horizontal_part(definition, node);
  definition.horizontal_code = definition.code;
  definition.kind = SystemKind::compound;
  definition.name = node.text(0);
  definition.code = code_of(node);
  read_vertical(*vertical, definition);
  read_area(node, definition);
  return definition;
}

// A system with the transformation to WGS 84 that belongs to it.
Definition read_bound(const WktNode& node) {
  const WktNode& source = need(node, "SOURCECRS");
  if (source.children.empty()) refuse(source, "is empty");
  Definition definition = read_system(source.children[0]);
  const WktNode& target = need(node, "TARGETCRS");
  if (target.children.empty()) refuse(target, "is empty");
  const Definition goal = read_system(target.children[0]);
  if (goal.datum.code != 6326 && !bare(goal.name).starts_with("wgs84")) {
    refuse(target, "is " + goal.name.substr(0, 80) + " and not WGS 84");
  }
  const WktNode& way = need(node, "ABRIDGEDTRANSFORMATION");
  const WktNode& method = need(way, "METHOD");
  const std::string name = bare(method.text(0));
  const bool position_vector = name.find("positionvector") != std::string::npos;
  const bool frame = name.find("coordinateframe") != std::string::npos;
  const bool translation = name.find("geocentrictranslation") != std::string::npos;
  if (!position_vector && !frame && !translation) {
    refuse(method, "is none that is known here; three or seven parameters to WGS 84 are");
  }
  static constexpr std::string_view kNames[] = {
      "xaxistranslation", "yaxistranslation", "zaxistranslation", "xaxisrotation",
      "yaxisrotation",    "zaxisrotation",    "scaledifference"};
  constexpr int kFirst = 8605;
  std::array<double, 7> seven{};
  for (const WktNode& child : way.children) {
    if (!child.is("PARAMETER")) continue;
    const int code = code_of(child);
    const auto by_name = std::find(std::begin(kNames), std::end(kNames), bare(child.text(0)));
    const auto i =
        static_cast<std::size_t>(code >= kFirst ? code - kFirst : by_name - std::begin(kNames));
    if (i >= seven.size()) {
      refuse(child, "\"" + child.text(0).substr(0, 80) + "\" is none of the seven to WGS 84");
    }
    const WktNode* unit = any_unit(child);
    double value = need_figure(child, 1) * factor_of(unit, 1);
    if (i >= 3 && i < 6) {
      if (unit != nullptr) value /= kDegreeInRadians / 3600;
      if (frame) value = -value;
    } else if (i == 6) {
      // An abridged transformation gives the scale as a factor; with a unit, also the difference.
      value = (value > 0.5 ? value - 1 : value) * 1e6;
      if (!(std::fabs(value) < 1e4)) refuse(child, "is no scale near one");
    }
    seven[i] = value;
  }
  definition.datum.to_wgs84 = seven;
  return definition;
}

Definition read_system(const WktNode& node) {
  if (is_projected(node)) return read_projected(node);
  if (is_geographic(node)) return read_geographic(node);
  if (node.is("COMPD_CS") || node.is("COMPOUNDCRS")) return read_compound(node);
  if (node.is("BOUNDCRS")) return read_bound(node);
  if (is_vertical(node)) {
    Definition definition;
    definition.kind = SystemKind::vertical;
    read_vertical(node, definition);
    definition.name = definition.vertical_name;
    definition.code = definition.vertical_code;
    read_area(node, definition);
    return definition;
  }
  throw Error("The WKT describes a " + node.value.substr(0, 60) +
              "; geographic, geocentric, projected, vertical and compound systems are known here" +
              place(node) + ".");
}

}  // namespace

Definition definition_from_wkt(std::string_view text) {
  while (!text.empty() && (text.back() == '\0' || text.back() == '\n' || text.back() == ' ' ||
                           text.back() == '\r' || text.back() == '\t')) {
    text.remove_suffix(1);
  }
  constexpr std::string_view kMark = "\xEF\xBB\xBF";  // as some .prj files begin
  if (text.starts_with(kMark)) text.remove_prefix(kMark.size());
  const std::vector<WktNode> objects = parse_wkt(text);
  Definition definition = read_system(objects.front());
  if (objects.size() == 1) return definition;
  // A .prj file may have the vertical system behind the horizontal one.
  const bool height = is_vertical(objects[1]);
  if (!height || objects.size() > 2) {
    const WktNode& odd = objects[height ? 2 : 1];
    throw Error("The WKT has a " + odd.value.substr(0, 60) + " after its system" + place(odd) +
                ".");
  }
  refuse_as_horizontal_part(definition, objects.front());
  definition.horizontal_code = definition.code;
  definition.code = 0;
  definition.kind = SystemKind::compound;
  read_vertical(objects[1], definition);
  definition.name += " + " + definition.vertical_name;
  return definition;
}

}  // namespace tidewater::detail
