// The table of projection methods and their parameters.
#include "methods.hpp"

#include <algorithm>
#include <array>
#include <cctype>
#include <string>

#include "makers.hpp"
#include "registry_names.hpp"

namespace tidewater::detail {

namespace {

using enum Quantity;

constexpr ParameterKind kKinds[] = {
    {kColatitude, angle, "Co-latitude of cone axis", "colatitude of the cone's axis", "colat", 0},
    {kEllipsoidScaling, scale, "Ellipsoid scaling factor", "ellipsoid scaling factor", "kell", 1},
    {kPlaneHeight, length, "Projection plane origin height", "height of the plane", "h0", 0},
    {kLat0, angle, "Latitude of natural origin", "latitude of origin", "lat0", 0},
    {kLon0, angle, "Longitude of natural origin", "central meridian", "lon0", 0},
    {kK0, scale, "Scale factor at natural origin", "scale on the central meridian", "k0", 1},
    {kX0, length, "False easting", "false easting", "x0", 0},
    {kY0, length, "False northing", "false northing", "y0", 0},
    {kLatC, angle, "Latitude of projection centre", "latitude of the centre", "lat0", 0},
    {kLonC, angle, "Longitude of projection centre", "longitude of the centre", "lon0", 0},
    {kAzimuth, angle, "Azimuth of initial line", "azimuth of the central line", "azimuth", 0},
    {kRectifiedAngle, angle, "Angle from Rectified to Skew Grid", "rectified grid angle", "gamma",
     0},
    {kLineScale, scale, "Scale factor on initial line", "scale on the central line", "k0", 1},
    {kXC, length, "Easting at projection centre", "easting at the centre", "x0", 0},
    {kYC, length, "Northing at projection centre", "northing at the centre", "y0", 0},
    {kPseudoParallel, angle, "Latitude of pseudo standard parallel", "pseudo standard parallel",
     "lat1", 0},
    {kPseudoScale, scale, "Scale factor on pseudo standard parallel",
     "scale on the pseudo standard parallel", "k0", 1},
    {kLatF, angle, "Latitude of false origin", "latitude of origin", "lat0", 0},
    {kLonF, angle, "Longitude of false origin", "central meridian", "lon0", 0},
    {kLat1, angle, "Latitude of 1st standard parallel", "first standard parallel", "lat1", 0},
    {kLat2, angle, "Latitude of 2nd standard parallel", "second standard parallel", "lat2", 0},
    {kXF, length, "Easting at false origin", "false easting", "x0", 0},
    {kYF, length, "Northing at false origin", "false northing", "y0", 0},
    {kInitialLon, angle, "Initial longitude", "initial longitude", "lonfirst", -kPi},
    {kZoneWidth, angle, "Zone width", "zone width", "width", 6 * kPi / 180},
    {kLatTrue, angle, "Latitude of standard parallel", "standard parallel", "lat1", 0},
    {kLonOrigin, angle, "Longitude of origin", "central meridian", "lon0", 0},
    {kTopoLat, angle, "Latitude of topocentric origin", "latitude of origin", "lat0", 0},
    {kTopoLon, angle, "Longitude of topocentric origin", "central meridian", "lon0", 0},
    {kTopoHeight, length, "Ellipsoidal height of topocentric origin", "height of the origin", "h0",
     0},
    {kViewHeight, length, "Viewpoint height", "height of the viewpoint", "h", 0},
    {kLatitudeOfFirstPoint, angle, "Latitude of 1st point", "latitude of the first point", "lat1",
     0},
    {kLongitudeOfFirstPoint, angle, "Longitude of 1st point", "longitude of the first point",
     "lon1", 0},
    {kLatitudeOfSecondPoint, angle, "Latitude of 2nd point", "latitude of the second point", "lat2",
     0},
    {kLongitudeOfSecondPoint, angle, "Longitude of 2nd point", "longitude of the second point",
     "lon2", 0},
    {kLatitudeOfThirdPoint, angle, "Latitude of 3rd point", "latitude of the third point", "lat3",
     0},
    {kLongitudeOfThirdPoint, angle, "Longitude of 3rd point", "longitude of the third point",
     "lon3", 0},
    {kTilt, angle, "Tilt", "tilt", "tilt", 0},
    {kSatellite, scale, "Satellite Number", "satellite", "satellite", 0},
    {kPath, scale, "Path Number", "path", "path", 1},
    {kInclination, angle, "Inclination of orbit", "inclination of the orbit", "inclination", 0},
    {kPeriodRatio, scale, "Period of revolution", "days of one revolution", "days", 0},
    {kAscendingNode, angle, "Longitude of ascending node", "longitude of the ascending node",
     "lon0", 0},
};

#define TW_FALSE_ORIGIN \
  {kX0, "x_0", "false_easting"}, { kY0, "y_0", "false_northing" }

constexpr MethodParameter kNaturalScaled[] = {
    {kLat0, "lat_0", "latitude_of_origin"},
    {kLon0, "lon_0", "central_meridian"},
    {kK0, "k_0", "scale_factor"},
    TW_FALSE_ORIGIN,
};
constexpr MethodParameter kOneParallelCone[] = {
    {kLat0, "lat_1", "latitude_of_origin"},
    {kLon0, "lon_0", "central_meridian"},
    {kK0, "k_0", "scale_factor"},
    TW_FALSE_ORIGIN,
};
constexpr MethodParameter kOneParallelConeB[] = {
    {kLat0, "lat_1", "standard_parallel_1"}, {kK0, "k_0", "scale_factor"},
    {kLatF, "lat_0", "latitude_of_origin"},  {kLonF, "lon_0", "central_meridian"},
    {kXF, "x_0", "false_easting"},           {kYF, "y_0", "false_northing"},
};
constexpr MethodParameter kTwoParallels[] = {
    {kLatF, "lat_0", "latitude_of_origin"},  {kLonF, "lon_0", "central_meridian"},
    {kLat1, "lat_1", "standard_parallel_1"}, {kLat2, "lat_2", "standard_parallel_2"},
    {kXF, "x_0", "false_easting"},           {kYF, "y_0", "false_northing"},
};
constexpr MethodParameter kTwoParallelsCentre[] = {
    {kLatF, "lat_0", "latitude_of_center"},  {kLonF, "lon_0", "longitude_of_center"},
    {kLat1, "lat_1", "standard_parallel_1"}, {kLat2, "lat_2", "standard_parallel_2"},
    {kXF, "x_0", "false_easting"},           {kYF, "y_0", "false_northing"},
};
constexpr MethodParameter kMichigan[] = {
    {kLatF, "lat_0", "latitude_of_origin"},
    {kLonF, "lon_0", "central_meridian"},
    {kLat1, "lat_1", "standard_parallel_1"},
    {kLat2, "lat_2", "standard_parallel_2"},
    {kXF, "x_0", "false_easting"},
    {kYF, "y_0", "false_northing"},
    {kEllipsoidScaling, "k_0", "ellipsoid_scaling_factor"},
};
constexpr MethodParameter kNatural[] = {
    {kLat0, "lat_0", "latitude_of_origin"}, {kLon0, "lon_0", "central_meridian"}, TW_FALSE_ORIGIN};
constexpr MethodParameter kNaturalCentre[] = {
    {kLat0, "lat_0", "latitude_of_center"},
    {kLon0, "lon_0", "longitude_of_center"},
    TW_FALSE_ORIGIN,
};
constexpr MethodParameter kTrueParallel[] = {{kLat1, "lat_ts", "standard_parallel_1"},
                                             {kLon0, "lon_0", "central_meridian"},
                                             TW_FALSE_ORIGIN};
constexpr MethodParameter kMercatorC[] = {{kLat1, "lat_ts", "standard_parallel_1"},
                                          {kLon0, "lon_0", "central_meridian"},
                                          {kLatF, "lat_0", "latitude_of_origin"},
                                          {kXF, "x_0", "false_easting"},
                                          {kYF, "y_0", "false_northing"}};
constexpr MethodParameter kEquidistant[] = {
    {kLat1, "lat_ts", "standard_parallel_1"},
    {kLat0, "lat_0", "latitude_of_origin"},
    {kLon0, "lon_0", "central_meridian"},
    TW_FALSE_ORIGIN,
};
constexpr MethodParameter kObliqueA[] = {
    {kLatC, "lat_0", "latitude_of_center"}, {kLonC, "lonc", "longitude_of_center"},
    {kAzimuth, "alpha", "azimuth"},         {kRectifiedAngle, "gamma", "rectified_grid_angle"},
    {kLineScale, "k_0", "scale_factor"},    TW_FALSE_ORIGIN,
};
constexpr MethodParameter kObliqueB[] = {
    {kLatC, "lat_0", "latitude_of_center"}, {kLonC, "lonc", "longitude_of_center"},
    {kAzimuth, "alpha", "azimuth"},         {kRectifiedAngle, "gamma", "rectified_grid_angle"},
    {kLineScale, "k_0", "scale_factor"},    {kXC, "x_0", "false_easting"},
    {kYC, "y_0", "false_northing"},
};
constexpr MethodParameter kSwiss[] = {
    {kLatC, "lat_0", "latitude_of_center"}, {kLonC, "lon_0", "longitude_of_center"},
    {kLineScale, "k_0", "scale_factor"},    {kXC, "x_0", "false_easting"},
    {kYC, "y_0", "false_northing"},
};
constexpr MethodParameter kTwoPoints[] = {
    {kLatC, "lat_0", "latitude_of_center"},
    {kLatitudeOfFirstPoint, "lat_1", "latitude_of_point_1"},
    {kLongitudeOfFirstPoint, "lon_1", "longitude_of_point_1"},
    {kLatitudeOfSecondPoint, "lat_2", "latitude_of_point_2"},
    {kLongitudeOfSecondPoint, "lon_2", "longitude_of_point_2"},
    {kLineScale, "k_0", "scale_factor"},
    TW_FALSE_ORIGIN,
};
constexpr MethodParameter kLaborde[] = {
    {kLatC, "lat_0", "latitude_of_center"},
    {kLonC, "lon_0", "longitude_of_center"},
    {kAzimuth, "azi", "azimuth"},
    {kLineScale, "k_0", "scale_factor"},
    TW_FALSE_ORIGIN,
};
constexpr MethodParameter kKrovak[] = {
    {kLatC, "lat_0", "latitude_of_center"}, {kLonOrigin, "lon_0", "longitude_of_center"},
    {kColatitude, "alpha", "azimuth"},      {kPseudoParallel, "", "pseudo_standard_parallel_1"},
    {kPseudoScale, "k_0", "scale_factor"},  TW_FALSE_ORIGIN,
};
constexpr MethodParameter kPolarB[] = {
    {kLatTrue, "lat_ts", "latitude_of_origin"},
    {kLonOrigin, "lon_0", "central_meridian"},
    TW_FALSE_ORIGIN,
};
constexpr MethodParameter kPolarC[] = {
    {kLatTrue, "lat_ts", "latitude_of_origin"},
    {kLonOrigin, "lon_0", "central_meridian"},
    {kXF, "x_0", "false_easting"},
    {kYF, "y_0", "false_northing"},
};
constexpr MethodParameter kZoned[] = {
    {kLat0, "", "latitude_of_origin"}, {kInitialLon, "", "initial_longitude"},
    {kZoneWidth, "", "zone_width"},    {kK0, "", "scale_factor"},
    {kX0, "", "false_easting"},        {kY0, "", "false_northing"},
};
constexpr MethodParameter kBonne[] = {
    {kLat0, "lat_1", "standard_parallel_1"}, {kLon0, "lon_0", "central_meridian"}, TW_FALSE_ORIGIN};
constexpr MethodParameter kMeridian[] = {{kLon0, "lon_0", "central_meridian"}, TW_FALSE_ORIGIN};
constexpr MethodParameter kFalseOrigin[] = {TW_FALSE_ORIGIN};
constexpr MethodParameter kColombia[] = {
    {kLat0, "lat_0", "latitude_of_origin"},
    {kLon0, "lon_0", "central_meridian"},
    TW_FALSE_ORIGIN,
    {kPlaneHeight, "h_0", "projection_plane_origin_height"},
};
constexpr MethodParameter kTunisia[] = {
    {kLatF, "", "latitude_of_origin"},
    {kLonF, "", "central_meridian"},
    {kXF, "", "false_easting"},
    {kYF, "", "false_northing"},
};
constexpr MethodParameter kLocal[] = {
    {kLatC, "lat_0", "latitude_of_center"}, {kLonC, "lon_0", "longitude_of_center"},
    {kAzimuth, "alpha", "azimuth"},         {kLineScale, "k_0", "scale_factor"},
    {kXC, "x_0", "false_easting"},          {kYC, "y_0", "false_northing"},
};
constexpr MethodParameter kVertical[] = {
    {kTopoLat, "lat_0", "latitude_of_center"},
    {kTopoLon, "lon_0", "longitude_of_center"},
    {kTopoHeight, "", "height_of_center"},
    {kViewHeight, "h", "height"},
    TW_FALSE_ORIGIN,
};
constexpr MethodParameter kTilted[] = {
    {kTopoLat, "lat_0", "latitude_of_center"},
    {kTopoLon, "lon_0", "longitude_of_center"},
    {kViewHeight, "h", "height"},
    {kAzimuth, "azi", "azimuth"},
    {kTilt, "tilt", "tilt"},
    TW_FALSE_ORIGIN,
};
constexpr MethodParameter kSheet[] = {
    {kLat1, "lat_1", "standard_parallel_1"},
    {kLon0, "lon_0", "central_meridian"},
    TW_FALSE_ORIGIN,
};
constexpr MethodParameter kSkew[] = {
    {kLatC, "", "latitude_of_center"}, {kLonC, "", "longitude_of_center"},
    {kAzimuth, "", "azimuth"},         {kLineScale, "", "scale_factor"},
    {kX0, "", "false_easting"},        {kY0, "", "false_northing"},
};
constexpr MethodParameter kObliqueCone[] = {
    {kLatC, "", "latitude_of_center"},  {kLonC, "", "longitude_of_center"},
    {kLat1, "", "standard_parallel_1"}, {kLat2, "", "standard_parallel_2"},
    {kAzimuth, "", "azimuth"},          {kLineScale, "", "scale_factor"},
    {kX0, "", "false_easting"},         {kY0, "", "false_northing"},
};
constexpr MethodParameter kThreePoints[] = {
    {kLatitudeOfFirstPoint, "lat_1", "latitude_of_1st_point"},
    {kLongitudeOfFirstPoint, "lon_1", "longitude_of_1st_point"},
    {kLatitudeOfSecondPoint, "lat_2", "latitude_of_2nd_point"},
    {kLongitudeOfSecondPoint, "lon_2", "longitude_of_2nd_point"},
    {kLatitudeOfThirdPoint, "lat_3", "latitude_of_3rd_point"},
    {kLongitudeOfThirdPoint, "lon_3", "longitude_of_3rd_point"},
    TW_FALSE_ORIGIN,
};
constexpr MethodParameter kIndian[] = {
    {kLat0, "", "latitude_of_origin"},
    {kLon0, "", "central_meridian"},
    {kX0, "", "false_easting"},
    {kY0, "", "false_northing"},
};
constexpr MethodParameter kOwnFalseOrigin[] = {
    {kX0, "", "false_easting"},
    {kY0, "", "false_northing"},
};
constexpr MethodParameter kOrbit[] = {
    {kInclination, "inc_angle", "inclination"},
    {kPeriodRatio, "ps_rev", "period_of_revolution"},
    {kAscendingNode, "asc_lon", "longitude_of_ascending_node"},
    TW_FALSE_ORIGIN,
};
constexpr MethodParameter kSatellitePath[] = {
    {kSatellite, "lsat", "satellite_number"},
    {kPath, "path", "path_number"},
    TW_FALSE_ORIGIN,
};

#undef TW_FALSE_ORIGIN

constexpr Method kMethods[] = {
    {9807, "Transverse Mercator", "transverse mercator|tmerc|gauss kruger|gauss krueger", "tmerc",
     "Transverse_Mercator", "Transverse_Mercator", kNaturalScaled, make_transverse_mercator},
    {1111, "Transverse Mercator 3D", "transverse mercator 3d", "tmerc", "Transverse_Mercator",
     "Transverse_Mercator", kNaturalScaled, make_transverse_mercator},
    {9808, "Transverse Mercator (South Orientated)", "transverse mercator south", "tmerc +axis=wsu",
     "Transverse_Mercator_South_Orientated", "Transverse_Mercator_South_Orientated", kNaturalScaled,
     make_transverse_mercator_south},
    {9824, "Transverse Mercator Zoned Grid System", "transverse mercator zoned", "",
     "Transverse_Mercator_Zoned_Grid_System", "", kZoned, make_zoned_transverse_mercator},
    {9802, "Lambert Conic Conformal (2SP)",
     "lambert conformal|lambert conformal conic|lcc|lambert conic conformal", "lcc",
     "Lambert_Conformal_Conic_2SP", "Lambert_Conformal_Conic", kTwoParallels, make_lambert_2sp},
    {9801, "Lambert Conic Conformal (1SP)", "lambert conformal 1sp|lcc 1sp", "lcc",
     "Lambert_Conformal_Conic_1SP", "Lambert_Conformal_Conic", kOneParallelCone, make_lambert_1sp},
    {1102, "Lambert Conic Conformal (1SP variant B)", "lambert conformal 1sp variant b", "lcc",
     "Lambert_Conformal_Conic_1SP_Variant_B", "", kOneParallelConeB, make_lambert_1sp_variant_b},
    {9826, "Lambert Conic Conformal (West Orientated)", "lambert conformal west", "lcc +axis=wnu",
     "Lambert_Conformal_Conic_West_Orientated", "", kOneParallelCone, make_lambert_west},
    {1051, "Lambert Conic Conformal (2SP Michigan)", "lambert conformal michigan", "lcc",
     "Lambert_Conformal_Conic_2SP_Michigan", "", kMichigan, make_lambert_michigan},
    {9803, "Lambert Conic Conformal (2SP Belgium)", "lambert conformal belgium", "lcc",
     "Lambert_Conformal_Conic_2SP_Belgium", "Lambert_Conformal_Conic_2SP_Belgium", kTwoParallels,
     make_lambert_belgium},
    {9817, "Lambert Conic Near-Conformal", "lambert near conformal", "",
     "Lambert_Conic_Near_Conformal", "", kNaturalScaled, make_lambert_near_conformal},
    {9805, "Mercator (variant B)", "mercator|merc", "merc", "Mercator_2SP", "Mercator",
     kTrueParallel, make_mercator_b},
    {9804, "Mercator (variant A)", "mercator 1sp|mercator variant a", "merc", "Mercator_1SP",
     "Mercator", kNaturalScaled, make_mercator_a},
    {1044, "Mercator (variant C)", "mercator variant c", "merc", "Mercator_Variant_C", "",
     kMercatorC, make_mercator_c},
    {1024, "Popular Visualisation Pseudo Mercator", "pseudo mercator|webmerc|popular mercator",
     "webmerc", "Popular_Visualisation_Pseudo_Mercator", "Mercator_Auxiliary_Sphere", kNatural,
     make_pseudo_mercator},
    {9815, "Hotine Oblique Mercator (variant B)", "oblique mercator|omerc|hotine oblique mercator",
     "omerc", "Hotine_Oblique_Mercator_Azimuth_Center", "Hotine_Oblique_Mercator_Azimuth_Center",
     kObliqueB, make_oblique_mercator_b},
    {9812, "Hotine Oblique Mercator (variant A)", "oblique mercator variant a", "omerc +no_uoff",
     "Hotine_Oblique_Mercator", "Hotine_Oblique_Mercator_Azimuth_Natural_Origin", kObliqueA,
     make_oblique_mercator_a},
    {9814, "Swiss Oblique Cylindrical", "swiss oblique mercator|somerc", "somerc",
     "Swiss_Oblique_Cylindrical", "Swiss_Oblique_Cylindrical", kSwiss, make_swiss_oblique},
    {kTwoPointOblique, "Hotine Oblique Mercator Two Point Natural Origin",
     "two point oblique mercator", "omerc +no_uoff",
     "Hotine_Oblique_Mercator_Two_Point_Natural_Origin",
     "Hotine_Oblique_Mercator_Two_Point_Natural_Origin", kTwoPoints, make_two_point_oblique},
    {kRectifiedSkewOrthomorphic, "Rectified Skew Orthomorphic", "rectified skew orthomorphic|rso",
     "", "Rectified_Skew_Orthomorphic", "", kSkew, make_rectified_skew},
    {9813, "Laborde Oblique Mercator", "laborde|labrd", "labrd", "Laborde_Oblique_Mercator", "",
     kLaborde, make_laborde},
    {9819, "Krovak", "krovak", "krovak +axis=swu", "Krovak", "Krovak", kKrovak, make_krovak},
    {1041, "Krovak (North Orientated)", "krovak north", "krovak", "Krovak_North_Orientated",
     "Krovak", kKrovak, make_krovak_north},
    {1042, "Krovak Modified", "krovak modified|modified krovak", "mod_krovak +axis=swu",
     "Krovak_Modified", "", kKrovak, make_krovak_modified},
    {1043, "Krovak Modified (North Orientated)", "krovak modified north", "mod_krovak",
     "Krovak_Modified_North_Orientated", "", kKrovak, make_krovak_modified_north},
    {kObliqueLambert, "Oblique Lambert Conformal Conic", "oblique lambert", "",
     "Oblique_Lambert_Conformal_Conic", "", kObliqueCone, make_oblique_lambert},
    {kBipolarConic, "Bipolar Oblique Conformal Conic", "bipolar conic|bipc", "bipc",
     "Bipolar_Oblique_Conformal_Conic", "", kFalseOrigin, make_bipolar_conic},
    {9809, "Oblique Stereographic", "oblique stereographic|double stereographic|sterea", "sterea",
     "Oblique_Stereographic", "Double_Stereographic", kNaturalScaled, make_oblique_stereographic},
    {kStereographic, "Stereographic", "stereographic|stere", "stere", "Stereographic",
     "Stereographic", kNaturalScaled, make_stereographic},
    {9810, "Polar Stereographic (variant A)", "polar stereographic variant a", "stere",
     "Polar_Stereographic", "Stereographic_North_Pole", kNaturalScaled, make_polar_stereographic_a},
    {9829, "Polar Stereographic (variant B)", "polar stereographic variant b", "stere",
     "Polar_Stereographic", "Stereographic_North_Pole", kPolarB, make_polar_stereographic_b},
    {9830, "Polar Stereographic (variant C)", "polar stereographic variant c", "stere",
     "Polar_Stereographic_Variant_C", "", kPolarC, make_polar_stereographic_c},
    {9811, "New Zealand Map Grid", "new zealand map grid|nzmg", "nzmg", "New_Zealand_Map_Grid",
     "New_Zealand_Map_Grid", kNatural, make_new_zealand},

    {9822, "Albers Equal Area", "albers|albers equal area|aea", "aea", "Albers_Conic_Equal_Area",
     "Albers", kTwoParallelsCentre, make_albers},
    {9820, "Lambert Azimuthal Equal Area", "azimuthal equal area|lambert azimuthal equal area|laea",
     "laea", "Lambert_Azimuthal_Equal_Area", "Lambert_Azimuthal_Equal_Area", kNaturalCentre,
     make_azimuthal_equal_area},
    {1027, "Lambert Azimuthal Equal Area (Spherical)", "azimuthal equal area spherical", "laea",
     "Lambert_Azimuthal_Equal_Area_Spherical", "", kNaturalCentre,
     make_azimuthal_equal_area_spherical},
    {9835, "Lambert Cylindrical Equal Area", "cylindrical equal area|cea", "cea",
     "Cylindrical_Equal_Area", "Cylindrical_Equal_Area", kTrueParallel,
     make_cylindrical_equal_area},
    {9834, "Lambert Cylindrical Equal Area (Spherical)", "cylindrical equal area spherical", "cea",
     "Cylindrical_Equal_Area_Spherical", "", kTrueParallel, make_cylindrical_equal_area_spherical},
    {1078, "Equal Earth", "equal earth|eqearth", "eqearth", "Equal_Earth", "Equal_Earth", kMeridian,
     make_equal_earth},
    {9827, "Bonne", "bonne", "bonne", "Bonne", "Bonne", kBonne, make_bonne},
    {9828, "Bonne (South Orientated)", "bonne south", "bonne +axis=wsu", "Bonne_South_Orientated",
     "", kBonne, make_bonne_south},
    {kSinusoidal, "Sinusoidal", "sinusoidal|sinu", "sinu", "Sinusoidal", "Sinusoidal", kMeridian,
     make_sinusoidal},
    {kMollweide, "Mollweide", "mollweide|moll", "moll", "Mollweide", "Mollweide", kMeridian,
     make_mollweide},
    {kEckert4, "Eckert IV", "eckert iv|eckert 4|eck4", "eck4", "Eckert_IV", "Eckert_IV", kMeridian,
     make_eckert4},

    {9806, "Cassini-Soldner", "cassini|cassini soldner|cass", "cass", "Cassini_Soldner", "Cassini",
     kNatural, make_cassini},
    {9833, "Hyperbolic Cassini-Soldner", "hyperbolic cassini", "cass +hyperbolic",
     "Hyperbolic_Cassini_Soldner", "", kNatural, make_hyperbolic_cassini},
    {9818, "American Polyconic", "polyconic|poly", "poly", "Polyconic", "Polyconic", kNatural,
     make_polyconic},
    {kImwPolyconic, "Modified Polyconic", "imw polyconic|modified polyconic", "", "IMW_Polyconic",
     "", kSheet, make_imw_polyconic},
    {1028, "Equidistant Cylindrical", "equidistant cylindrical|equirectangular", "eqc",
     "Equirectangular", "Equidistant_Cylindrical", kEquidistant, make_equidistant_cylindrical},
    {1029, "Equidistant Cylindrical (Spherical)",
     "equidistant cylindrical spherical|plate carree|eqc", "eqc", "Equirectangular",
     "Equidistant_Cylindrical", kEquidistant, make_equidistant_cylindrical_spherical},
    {kEquidistantConic, "Equidistant Conic", "equidistant conic|eqdc", "eqdc", "Equidistant_Conic",
     "Equidistant_Conic", kTwoParallelsCentre, make_equidistant_conic},
    {kAzimuthalEquidistant, "Azimuthal Equidistant", "azimuthal equidistant|aeqd", "aeqd",
     "Azimuthal_Equidistant", "Azimuthal_Equidistant", kNaturalCentre, make_azimuthal_equidistant},
    {9832, "Modified Azimuthal Equidistant", "modified azimuthal equidistant", "aeqd",
     "Modified_Azimuthal_Equidistant", "", kNaturalCentre, make_modified_azimuthal_equidistant},
    {9831, "Guam Projection", "guam", "aeqd +guam", "Guam_Projection", "", kNaturalCentre,
     make_guam},
    {1052, "Colombia Urban", "colombia urban|col urban", "col_urban", "Colombia_Urban", "",
     kColombia, make_colombia_urban},
    {9816, "Tunisia Mining Grid", "tunisia mining", "", "Tunisia_Mining_Grid", "", kTunisia,
     make_tunisia_mining},
    {kRobinson, "Robinson", "robinson|robin", "robin", "Robinson", "Robinson", kMeridian,
     make_robinson},
    {kMiller, "Miller Cylindrical", "miller|mill", "mill", "Miller_Cylindrical",
     "Miller_Cylindrical", kMeridian, make_miller},
    {kVanDerGrinten, "Van Der Grinten", "van der grinten|vandg", "vandg", "VanDerGrinten",
     "Van_der_Grinten_I", kMeridian, make_van_der_grinten},
    {kGnomonic, "Gnomonic", "gnomonic|gnom", "gnom", "Gnomonic", "Gnomonic", kNatural,
     make_gnomonic},
    {9840, "Orthographic", "orthographic|ortho", "ortho", "Orthographic", "Orthographic", kNatural,
     make_orthographic},
    {1130, "Local Orthographic", "local orthographic", "ortho", "Local_Orthographic", "", kLocal,
     make_local_orthographic},
    {9838, "Vertical Perspective", "vertical perspective|nsper", "nsper", "Vertical_Perspective",
     "Vertical_Near_Side_Perspective", kVertical, make_vertical_perspective},
    {kTiltedPerspective, "Tilted Perspective", "tilted perspective|tpers", "tpers",
     "Tilted_Perspective", "", kTilted, make_tilted_perspective},
    {kChamberlin, "Chamberlin Trimetric", "chamberlin trimetric|chamberlin|chamb", "chamb",
     "Chamberlin_Trimetric", "", kThreePoints, make_chamberlin},
    {kSpaceOblique, "Space Oblique Mercator", "space oblique mercator|som", "som",
     "Space_Oblique_Mercator", "", kOrbit, make_space_oblique},
    {kLandsat, "Space Oblique Mercator (Landsat)", "space oblique mercator landsat|landsat|lsat",
     "lsat", "Space_Oblique_Mercator_Landsat", "", kSatellitePath, make_landsat},
    {kIndianPolyhedric, "Indian Polyhedric", "indian polyhedric", "", "Indian_Polyhedric", "",
     kIndian, make_indian_polyhedric},
    {kMalaya, "Malaya Grid", "malaya grid", "", "Malaya_Grid", "", kOwnFalseOrigin, make_malaya},
};

}  // namespace

std::span<const Method> methods() { return kMethods; }

const Method* method_by_code(int code) {
  for (const Method& method : kMethods) {
    if (method.code == code) return &method;
  }
  return nullptr;
}

const Method* method_by_words(std::string_view words) {
  const std::string wanted = folded(words);
  if (wanted.empty()) return nullptr;
  for (const Method& method : kMethods) {
    std::string_view rest = method.words;
    while (true) {
      const auto bar = rest.find('|');
      if (wanted == rest.substr(0, bar)) return &method;
      if (bar == std::string_view::npos) break;
      rest.remove_prefix(bar + 1);
    }
    for (const auto name : {method.name, method.wkt1, method.esri}) {
      if (!name.empty() && folded(name) == wanted) return &method;
    }
  }
  return nullptr;
}

const ParameterKind* parameter_kind(int code) {
  for (const ParameterKind& kind : kKinds) {
    if (kind.code == code) return &kind;
  }
  return nullptr;
}

std::string_view truth_of(int method) {
  switch (method) {
    case 9807:
    case 9808:
    case 1111:
    case 9824:
      return "within 5 nm of the exact projection to 3,900 km from the central meridian, refused "
             "beyond";
    case kAzimuthalEquidistant:
      return "within 20 nm by geodesics";
    case kSpaceOblique:
    case kLandsat:
      return "true along the track within 2e-11";
    case kChamberlin:
      return "the mean of three distances, each within 20 nm; inverse within 5 cm along the sides";
    case 9806:
    case 9811:
    case 9813:
    case 9816:
    case 9817:
    case 9818:
    case 9831:
    case 9832:
    case 9833:
    case 1052:
    case 1042:
    case 1043:
    case kImwPolyconic:
    case kIndianPolyhedric:
    case kMalaya:
      return "the method is defined by its own series, which are taken whole";
    case 1024:
    case 1029:
    case 9834:
    case kRobinson:
    case kMollweide:
    case kEckert4:
    case kVanDerGrinten:
    case kMiller:
    case kGnomonic:
      return "formulas of a sphere of the semi-major axis, to rounding";
    case kBipolarConic:
      return "formulas of a sphere of the semi-major axis, to rounding; inverse within 1 mm";
    case 1027:
      return "formulas of the sphere of equal area, to rounding";
    default:
      return "closed formulas and series to rounding: within a micrometre in the area of use";
  }
}

void require(bool good, const MethodArguments& given, const char* why) {
  if (good) return;
  throw Error("The projection " + std::string(method_by_code(given.definition.method)->name) +
              " cannot be set up: " + why + ".");
}

void require(TWstatus word, const MethodArguments& given) {
  require(TW_OK(word), given,
          word == TW_BAD_LATITUDE ? "a latitude lies beyond a pole or at one that cannot serve"
                                  : "its parameters do not fit together");
}

void require_parallel(const MethodArguments& given, double lat) {
  require(std::fabs(lat) < kHalfPi - 1e-10, given, "the standard parallel lies at a pole");
}

}  // namespace tidewater::detail
