// Definitions as WKT.

#include <cmath>

#include "makers.hpp"
#include "text_forms.hpp"
#include "text_forms_parts.hpp"

namespace tidewater::detail {

namespace {

std::string in_quotes(std::string_view text) {
  std::string result = "\"";
  for (const char c : text) {
    if (c == '"') result += c;
    result += c;
  }
  return result + '"';
}

// Letters and digits, all else one underscore: the names of version 1's datums and of .prj files.
std::string underscored(std::string_view name) {
  std::string result;
  for (const char c : name) {
    const bool plain = (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || (c >= '0' && c <= '9') ||
                       c == '+' || (c & 0x80) != 0;
    if (plain) {
      result += c;
    } else if (!result.empty() && result.back() != '_') {
      result += '_';
    }
  }
  if (!result.empty() && result.back() == '_') result.pop_back();
  return result;
}

std::string_view either(std::string_view name, std::string_view otherwise = "unknown") {
  return name.empty() ? otherwise : name;
}

// One text grows from left to right.
class Writer {
 public:
  explicit Writer(Wkt version) : version_(version) {}

  std::string whole(const Definition& definition) {
    const bool bound = version_ == Wkt::wkt2 && definition.datum.to_wgs84.has_value();
    if (bound) out_ += "BOUNDCRS[SOURCECRS[";
    if (definition.kind == SystemKind::compound) {
      compound(definition);
    } else if (definition.kind == SystemKind::vertical) {
      vertical(definition, definition.code);
    } else {
      horizontal(definition);
    }
    if (bound) {
      out_ += "],";
      to_wgs84(*definition.datum.to_wgs84);
    }
    return std::move(out_);
  }

 private:
  bool second() const { return version_ == Wkt::wkt2; }
  bool esri() const { return version_ == Wkt::esri; }
  std::string in_dialect(std::string_view name) const {
    return esri() ? underscored(name) : std::string(name);
  }

  void id(int code) {
    if (code <= 0 || esri()) return;
    out_ += (second() ? ",ID[\"EPSG\"," : ",AUTHORITY[\"EPSG\",\"") + std::to_string(code) +
            (second() ? "]" : "\"]");
  }

  void unit(const char* keyword, const UnitDefinition& unit, const char* otherwise) {
    std::string name(either(unit.name, otherwise));
    if (esri() && name == "metre") name = "Meter";
    if (esri() && name == "degree") name = "Degree";
    if (esri() && name == "US survey foot") name = "Foot_US";
    out_ += std::string(",") + (second() ? keyword : "UNIT") + "[" + in_quotes(name) + "," +
            number_text(unit.factor);
    id(unit.code);
    out_ += "]";
  }
  void degree() { unit("ANGLEUNIT", {"degree", 9102, kDegreeInRadians}, "degree"); }

  void ellipsoid(const EllipsoidDefinition& ellipsoid) {
    out_ += second() ? "ELLIPSOID[" : "SPHEROID[";
    out_ += in_quotes(in_dialect(either(ellipsoid.name))) + "," + number_text(ellipsoid.a) + "," +
            number_text(ellipsoid.inverse_flattening);
    if (second()) out_ += ",LENGTHUNIT[\"metre\",1]";
    id(ellipsoid.code);
    out_ += "]";
  }

  void datum(const DatumDefinition& datum) {
    std::string name(either(datum.name));
    if (!second()) name = underscored(name);
    if (!second() && datum.code == 6326) name = "WGS_1984";
    if (esri() && !name.starts_with("D_")) name.insert(0, "D_");
    out_ += ",DATUM[" + in_quotes(name);
    out_ += ",";
    ellipsoid(datum.ellipsoid);
    if (!second() && !esri() && datum.to_wgs84) {
      out_ += ",TOWGS84[";
      for (std::size_t i = 0; i < 7; ++i) {
        out_ += (i == 0 ? "" : ",") + number_text((*datum.to_wgs84)[i]);
      }
      out_ += "]";
    }
    id(datum.code);
    out_ += "],PRIMEM[" + in_quotes(either(datum.meridian.name)) + "," +
            degrees_text(datum.meridian.longitude);
    if (second()) degree();
    id(datum.meridian.code);
    out_ += "]";
  }

  // Of a projected system's base, or of a system in version 1.
  void geographic_head(const char* keyword, std::string_view given, const Definition& definition) {
    std::string name = in_dialect(either(given));
    if (esri() && !name.starts_with("GCS_")) name.insert(0, "GCS_");
    out_ += std::string(keyword) + "[" + in_quotes(name);
    datum(definition.datum);
  }

  void axes(const Definition& definition, const char* keyword, const char* const names[3]) {
    const std::size_t count = definition.kind == SystemKind::geographic3d ? 3 : 2;
    for (std::size_t i = 0; i < count; ++i) {
      const char letter = definition.axes[i];
      const bool east = letter == 'E' || letter == 'W';
      const bool up = letter == 'U';
      std::string direction = letter == 'E'   ? "east"
                              : letter == 'W' ? "west"
                              : letter == 'N' ? "north"
                              : letter == 'S' ? "south"
                                              : "up";
      if (!second()) {
        for (char& c : direction) c = static_cast<char>(c - 32);  // capitals
      }
      out_ += ",AXIS[" + in_quotes(names[up ? 2 : east ? 0 : 1]) + "," + direction;
      if (second()) {
        out_ += ",ORDER[" + std::to_string(i + 1) + "]";
        if (up) {
          out_ += ",LENGTHUNIT[\"metre\",1]";
        } else {
          unit(keyword, definition.unit, "unknown");
        }
      }
      out_ += "]";
    }
  }
  void usage(const Definition& definition) {
    if (!second() || definition.area.empty()) return;
    out_ += ",USAGE[SCOPE[\"unknown\"],AREA[" + in_quotes(definition.area) + "],BBOX[" +
            number_text(definition.south) + "," + number_text(definition.west) + "," +
            number_text(definition.north) + "," + number_text(definition.east) + "]]";
  }

  void geographic(const Definition& definition) {
    static const char* const kNames[] = {"geodetic longitude (Lon)", "geodetic latitude (Lat)",
                                         "ellipsoidal height (h)"};
    static const char* const kNamesOfVersion1[] = {"Longitude", "Latitude", "Ellipsoidal height"};
    const bool height = definition.kind == SystemKind::geographic3d;
    if (second()) {
      geographic_head("GEOGCRS", definition.name, definition);
      out_ += height ? ",CS[ellipsoidal,3]" : ",CS[ellipsoidal,2]";
      axes(definition, "ANGLEUNIT", kNames);
      usage(definition);
    } else {
      geographic_head("GEOGCS", definition.name, definition);
      unit("ANGLEUNIT", definition.unit, "unknown");
      if (esri() && height) out_ += ",LINUNIT[\"Meter\",1]";
      if (!esri()) axes(definition, "", kNamesOfVersion1);
    }
    id(definition.code);
    out_ += "]";
  }

  void geocentric(const Definition& definition) {
    geographic_head(second() ? "GEODCRS" : "GEOCCS", definition.name, definition);
    if (second()) {
      out_ += ",CS[Cartesian,3]";
      int order = 0;
      for (const char* axis : {"X", "Y", "Z"}) {
        out_ += ",AXIS[\"(" + std::string(axis) + ")\",geocentric" + axis + ",ORDER[" +
                std::to_string(++order) + "]";
        unit("LENGTHUNIT", definition.unit, "unknown");
        out_ += "]";
      }
      usage(definition);
    } else {
      unit("LENGTHUNIT", definition.unit, "unknown");
      out_ +=
          ",AXIS[\"Geocentric X\",OTHER],AXIS[\"Geocentric Y\",OTHER],"
          "AXIS[\"Geocentric Z\",NORTH]";
    }
    id(definition.code);
    out_ += "]";
  }

  void parameter(std::string_view name, double value, Quantity quantity, int code,
                 const Definition& definition) {
    out_ += ",PARAMETER[" + in_quotes(name) + ",";
    if (quantity == Quantity::angle) {
      out_ += degrees_text(value);
      if (second()) degree();
    } else if (quantity == Quantity::length) {
      // Version 1 has lengths in the unit of the system.
      out_ += number_text(second() ? value : value / definition.unit.factor);
      if (second()) out_ += ",LENGTHUNIT[\"metre\",1]";
    } else {
      out_ += number_text(value);
      if (second()) out_ += ",SCALEUNIT[\"unity\",1]";
    }
    if (second()) id(code);
    out_ += "]";
  }

  // Names of version 1 that are common; all others are made of the registry's.
  static bool has_common_name(int method) {
    switch (method) {
      case 1102:
      case 9826:
      case 1051:
      case 9817:
      case 1044:
      case 9830:
      case 9828:
      case 1042:
      case 1043:
      case 9824:
      case 9816:
      case 1052:
      case 9831:
      case 9832:
      case 9833:
      case 1130:
      case 9838:
      case 1078:
      case 1027:
      case 9834:
        return false;
      default:
        return true;
    }
  }

  // The dialect's Mercator has the parallel of true scale in place of the scale on the equator.
  void mercator_of_esri(const Definition& definition, const std::string& name) {
    const double k0 = definition.parameter(kK0, 1);
    const double rf = definition.datum.ellipsoid.inverse_flattening;
    const double f = rf == 0 ? 0 : 1 / rf;
    const double e2 = f * (2 - f);
    if (!(k0 <= 1)) {
      throw Error("The dialect of .prj files has no Mercator with a scale above one, which " +
                  definition.name + " has.");
    }
    const double parallel = std::asin(std::sqrt((1 - k0 * k0) / (1 - k0 * k0 * e2)));
    out_ += ",PROJECTION[" + in_quotes(name) + "]";
    parameter("False_Easting", definition.parameter(kX0), Quantity::length, 0, definition);
    parameter("False_Northing", definition.parameter(kY0), Quantity::length, 0, definition);
    parameter("Central_Meridian", definition.parameter(kLon0), Quantity::angle, 0, definition);
    parameter("Standard_Parallel_1", parallel, Quantity::angle, 0, definition);
  }

  void method_of_version_1(const Definition& definition, const Method& method) {
    const bool common = esri() ? !method.esri.empty() : has_common_name(method.code);
    std::string name(esri() ? method.esri : method.wkt1);
    if (!common) {
      name = method.name;
      for (char& c : name) c = c == ' ' ? '_' : c;
    }
    const double pole = definition.parameter(kLatTrue);
    const bool polar = method.code == 9829;
    if (esri() && polar && pole < 0) name = "Stereographic_South_Pole";
    // The dialect has no polar grid with a scale at the pole; it is written as in version 1.
    if (esri() && method.code == 9810) name = method.wkt1;
    // Its axes or its rotation tell it from the other Krovak.
    if (method.code == 1041) name = "Krovak";
    if (esri() && method.code == 9804) {
      mercator_of_esri(definition, name);
      return;
    }
    out_ += ",PROJECTION[" + in_quotes(name) + "]";
    for (const MethodParameter& given : method.parameters) {
      const ParameterKind& kind = *parameter_kind(given.code);
      const double value = definition.parameter(given.code, kind.usual);
      std::string_view word = common ? given.wkt1 : kind.name;
      // A Mercator on the equator and a polar grid with its scale have no latitude in version 1.
      if (!esri() && method.code == 9804 && given.code == kLat0 && value == 0) continue;
      if (esri()) {
        if (polar && given.code == kLatTrue) word = "Standard_Parallel_1";
        if (method.code == 1024 && given.code == kLat0) word = "Standard_Parallel_1";
        if ((method.code == 9815 || method.code == 9812) && given.code == kRectifiedAngle) {
          // The dialect has another name where the grid is not rectified by the azimuth itself.
          if (std::fabs(value - definition.parameter(kAzimuth)) < 1e-14) continue;
          const auto at = out_.rfind("PROJECTION[");
          const auto end = out_.find(']', at);
          out_.replace(at, end - at,
                       method.code == 9815
                           ? "PROJECTION[\"Rectified_Skew_Orthomorphic_Center\""
                           : "PROJECTION[\"Rectified_Skew_Orthomorphic_Natural_Origin\"");
          word = "XY_Plane_Rotation";
        }
      }
      parameter(word, value, kind.quantity, 0, definition);
    }
    if (!esri()) return;
    if (method.code == 9801) {
      parameter("Standard_Parallel_1", definition.parameter(kLat0), Quantity::angle, 0, definition);
    }
    if (method.code == 1024) parameter("Auxiliary_Sphere_Type", 0, Quantity::scale, 0, definition);
    if (method.code == 9819 || method.code == 1041) {
      const bool north = method.code == 1041;
      parameter("X_Scale", north ? -1 : 1, Quantity::scale, 0, definition);
      parameter("Y_Scale", 1, Quantity::scale, 0, definition);
      parameter("XY_Plane_Rotation", (north ? 90 : 0) * kDegreeInRadians, Quantity::angle, 0,
                definition);
    }
  }

  void projected(const Definition& definition, int code) {
    static const char* const kNames[] = {"(E)", "(N)", "(H)"};
    static const char* const kNamesOfVersion1[] = {"Easting", "Northing", "Height"};
    const Method& method = method_of(definition);
    const std::string_view name = either(definition.name);
    const std::string_view base = either(definition.base, definition.datum.name);
    if (second()) {
      out_ += "PROJCRS[" + in_quotes(name) + ",";
      geographic_head("BASEGEOGCRS", base, definition);
      id(definition.base_code);
      out_ += "],CONVERSION[" + in_quotes(either(definition.conversion, "unnamed")) + ",METHOD[" +
              in_quotes(method.name);
      id(method.code);
      out_ += "]";
      for (const MethodParameter& given : method.parameters) {
        const ParameterKind& kind = *parameter_kind(given.code);
        parameter(kind.name, definition.parameter(given.code, kind.usual), kind.quantity,
                  given.code, definition);
      }
      out_ += "],CS[Cartesian,2]";
      axes(definition, "LENGTHUNIT", kNames);
      usage(definition);
    } else {
      out_ += "PROJCS[" + in_quotes(in_dialect(name)) + ",";
      geographic_head("GEOGCS", base, definition);
      degree();
      id(definition.base_code);
      out_ += "]";
      method_of_version_1(definition, method);
      unit("LENGTHUNIT", definition.unit, "unknown");
      if (!esri()) axes(definition, "", kNamesOfVersion1);
      if (method.code == 1024 && !esri()) {
        out_ += ",EXTENSION[\"PROJ4\",\"+proj=merc +a=6378137 +b=6378137 +lat_ts=0 +lon_0=" +
                degrees_text(definition.parameter(kLon0)) +
                " +x_0=" + number_text(definition.parameter(kX0)) +
                " +y_0=" + number_text(definition.parameter(kY0)) +
                " +k=1 +units=m +nadgrids=@null +wktext +no_defs\"]";
      }
    }
    id(code);
    out_ += "]";
  }

  void horizontal(const Definition& definition) {
    if (definition.kind == SystemKind::geocentric) {
      geocentric(definition);
    } else if (definition.method != 0) {
      projected(definition, definition.code);
    } else {
      geographic(definition);
    }
  }

  void vertical(const Definition& definition, int code) {
    const bool down = definition.axes.ends_with('D');
    const std::string& name = definition.vertical_name;
    const std::string_view datum = either(definition.vertical_datum, name);
    if (second()) {
      out_ += "VERTCRS[" + in_quotes(name) + ",VDATUM[" + in_quotes(datum) + "],CS[vertical,1]" +
              (down ? ",AXIS[\"depth (D)\",down" : ",AXIS[\"gravity-related height (H)\",up");
      unit("LENGTHUNIT", definition.vertical_unit, "metre");
      out_ += "]";
    } else if (esri()) {
      out_ += "VERTCS[" + in_quotes(underscored(name)) + ",VDATUM[" +
              in_quotes(underscored(datum)) +
              "],PARAMETER[\"Vertical_Shift\",0.0],PARAMETER[\"Direction\"," +
              (down ? "-1.0]" : "1.0]");
      unit("LENGTHUNIT", definition.vertical_unit, "metre");
    } else {
      out_ += "VERT_CS[" + in_quotes(name) + ",VERT_DATUM[" + in_quotes(datum) + ",2005]";
      unit("LENGTHUNIT", definition.vertical_unit, "metre");
      out_ += down ? ",AXIS[\"Depth\",DOWN]" : ",AXIS[\"Gravity-related height\",UP]";
    }
    id(code);
    out_ += "]";
  }

  void compound(const Definition& definition) {
    Definition part = definition;
    part.code = definition.horizontal_code;
    part.kind = definition.method != 0 ? SystemKind::projected : SystemKind::geographic2d;
    part.area.clear();
    // "OSGB36 / British National Grid + ODN height" names its parts.
    const auto plus = definition.name.find(" + ");
    if (plus != std::string::npos) part.name = definition.name.substr(0, plus);
    part.axes = definition.axes.substr(0, 2);
    if (!esri()) {
      out_ += (second() ? "COMPOUNDCRS[" : "COMPD_CS[") + in_quotes(definition.name) + ",";
    }
    horizontal(part);
    out_ += ",";
    vertical(definition, definition.vertical_code);
    if (esri()) return;
    usage(definition);
    id(definition.code);
    out_ += "]";
  }

  void to_wgs84(const std::array<double, 7>& seven) {
    static const char* const kNames[] = {
        "X-axis translation", "Y-axis translation", "Z-axis translation", "X-axis rotation",
        "Y-axis rotation",    "Z-axis rotation",    "Scale difference"};
    Definition wgs84;
    wgs84.name = "WGS 84";
    wgs84.code = 4326;
    wgs84.datum.name = "World Geodetic System 1984";
    wgs84.datum.ellipsoid = {"WGS 84", 7030, 6378137, 298.257223563};
    wgs84.unit = {"degree", 9102, kDegreeInRadians};
    wgs84.axes = "NE";
    out_ += "TARGETCRS[";
    geographic(wgs84);
    out_ +=
        "],ABRIDGEDTRANSFORMATION[\"Transformation to WGS 84\","
        "METHOD[\"Position Vector transformation (geog2D domain)\",ID[\"EPSG\",9606]]";
    for (std::size_t i = 0; i < 7; ++i) {
      out_ += ",PARAMETER[" + in_quotes(kNames[i]) + ",";
      if (i < 3) {
        out_ += number_text(seven[i]) + ",LENGTHUNIT[\"metre\",1]";
      } else if (i < 6) {
        out_ += number_text(seven[i]) + ",ANGLEUNIT[\"arc-second\",4.84813681109536E-06]";
      } else {
        out_ += number_text(1 + seven[i] * 1e-6);
      }
      id(static_cast<int>(8605 + i));
      out_ += "]";
    }
    out_ += "]]";
  }

  Wkt version_;
  std::string out_;
};

}  // namespace

std::string wkt_from_definition(const Definition& definition, Wkt version) {
  return Writer(version).whole(definition);
}

}  // namespace tidewater::detail
