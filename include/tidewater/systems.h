/**
 * @file systems.h
 * The systems layer for C and for bindings: named systems, transformations, projections.
 *
 * Objects are opaque handles: a maker gives one, or null with the reason in tw_last_error(); its
 * destroyer takes it back (null is taken too).  A handle may be used by any number of threads at
 * once, but for its destruction.  Functions that write a text take a buffer and its size and return
 * the text's length without the end: where that is not less than the size the text was cut, and a
 * null buffer of size 0 asks for the length alone.  Texts are UTF-8.
 *
 * Longitude or easting first, degrees, metres above the ellipsoid; see system.hpp and
 * transformation.hpp, whose objects these are.
 *
 * Accuracy: no figure; the C interface of the objects, whose rows hold (docs/accuracy.md).
 */
#ifndef TIDEWATER_SYSTEMS_H
#define TIDEWATER_SYSTEMS_H

#include <stddef.h>
#include <stdint.h>

#include "tidewater/frame.h"
#include "tidewater/version.h"

#if defined(TIDEWATER_STATIC) || defined(TIDEWATER_SYSTEMS_STATIC)
#define TW_SYSTEMS_C_API
#elif defined(_WIN32)
#if defined(TIDEWATER_SYSTEMS_BUILDING)
#define TW_SYSTEMS_C_API __declspec(dllexport)
#else
#define TW_SYSTEMS_C_API __declspec(dllimport)
#endif
#else
#define TW_SYSTEMS_C_API __attribute__((visibility("default")))
#endif

#ifdef __cplusplus
extern "C" {
#endif

/** @name Help
 *  @{ */

/** The version of the library that is loaded, as TIDEWATER_VERSION is that of the headers. */
TW_SYSTEMS_C_API const char* tw_version(void);

/** What a status word says, in a sentence; never null, and the text stays. */
TW_SYSTEMS_C_API const char* tw_status_text(TWstatus status);

/** Why the last maker of this thread gave null; never null.  The text stays until the thread's next
 *  failure. */
TW_SYSTEMS_C_API const char* tw_last_error(void);
/** @} */

/** @name Coordinate systems
 *  @{ */

/** A coordinate system, a System. */
typedef struct tw_system tw_system;

/** What a system's coordinates are. */
typedef enum tw_kind {
  TW_GEOGRAPHIC_2D = 0,
  TW_GEOGRAPHIC_3D = 1,
  TW_GEOCENTRIC = 2,
  TW_PROJECTED = 3,
  TW_VERTICAL = 4,
  TW_COMPOUND = 5
} tw_kind;

/**
 * From a code, a name, a definition, a PROJ string or WKT: everything that System takes.
 * @return null where the text is not understood
 */
TW_SYSTEMS_C_API tw_system* tw_system_create(const char* text);
/** The same, where the zone of "utm", "ups" or "mgrs" is found from a point in degrees. */
TW_SYSTEMS_C_API tw_system* tw_system_create_at(const char* text, double longitude,
                                                double latitude);
/** Takes a system back. */
TW_SYSTEMS_C_API void tw_system_destroy(tw_system* system);

TW_SYSTEMS_C_API int32_t tw_system_code(const tw_system* system); /**< 0 without one */
/** What its coordinates are. */
TW_SYSTEMS_C_API tw_kind tw_system_kind(const tw_system* system);
/** Metres or radians in one unit of the horizontal axes. */
TW_SYSTEMS_C_API double tw_system_unit_factor(const tw_system* system);
/** Its name. */
TW_SYSTEMS_C_API size_t tw_system_name(const tw_system* system, char* text, size_t size);
/** The name of its datum. */
TW_SYSTEMS_C_API size_t tw_system_datum(const tw_system* system, char* text, size_t size);
/** The name of its projection method; empty without one. */
TW_SYSTEMS_C_API size_t tw_system_method(const tw_system* system, char* text, size_t size);
/** The name of the unit of its horizontal axes. */
TW_SYSTEMS_C_API size_t tw_system_unit(const tw_system* system, char* text, size_t size);
/** Its axes in their own order: letters E N W S U, or "XYZ". */
TW_SYSTEMS_C_API size_t tw_system_axes(const tw_system* system, char* text, size_t size);
/** All of the system in words, a line each. */
TW_SYSTEMS_C_API size_t tw_system_describe(const tw_system* system, char* text, size_t size);
/**
 * The system as another text.
 * @param system  the system
 * @param form    "wkt2", "wkt1", "esri" or "proj"
 * @param text    size places, or null
 * @param size    of the buffer
 * @return the length; 0 with the reason in tw_last_error() where there is no such form of it
 */
TW_SYSTEMS_C_API size_t tw_system_text(const tw_system* system, const char* form, char* text,
                                       size_t size);
/**
 * The area of use.
 * @param system  the system
 * @param bounds  west, south, east, north in degrees; west is greater than east across the 180th
 *                meridian
 * @return 0 where the area is not known, and bounds are the whole Earth's
 */
TW_SYSTEMS_C_API int32_t tw_system_area(const tw_system* system, double bounds[4]);

/**
 * Systems whose names have these words, without regard to case and accents.
 * @param words  separated by blanks; each must occur
 * @param codes  limit places; names are those of tw_system_create("EPSG:code")
 * @param limit  how many at most
 * @return how many codes were written
 */
TW_SYSTEMS_C_API size_t tw_system_search(const char* words, int32_t* codes, size_t limit);
/** @} */

/** @name Transformations
 *  @{ */

/** A Transformation. */
typedef struct tw_transformation tw_transformation;

/** What a transformation is asked beyond its two systems; all zero is what is usual. */
typedef struct tw_transformation_options {
  const char* operation;    /**< as TransformationOptions::operation; null: the best */
  const char* grid_folders; /**< folders separated by line feeds, or null */
  double epoch;             /**< decimal year of the coordinates; 0: none */
  const double* area;       /**< west, south, east, north in degrees of the points, or null */
  int32_t radians;          /**< not 0: geographic coordinates in radians */
  int32_t own_axes;         /**< not 0: axes in the systems' own order */
} tw_transformation_options;

/**
 * @param source   where points come from
 * @param target   where they go
 * @param options  may be null
 * @return null where no datum operation is known or can be used
 */
TW_SYSTEMS_C_API tw_transformation* tw_transformation_create(
    const tw_system* source, const tw_system* target, const tw_transformation_options* options);
/** Takes a transformation back. */
TW_SYSTEMS_C_API void tw_transformation_destroy(tw_transformation* transformation);

/** Where an array's points stand. */
typedef struct tw_points {
  double* x;
  double* y;
  double* z;        /**< null: zero on input, not written on output */
  ptrdiff_t stride; /**< from one point to the next in doubles: 1 for separate arrays */
} tw_points;

/** The same for single precision. */
typedef struct tw_points_f {
  float* x;
  float* y;
  float* z;
  ptrdiff_t stride; /**< in floats */
} tw_points_f;

/**
 * Points of the source to points of the target, or back.
 * @param transformation  the way
 * @param inverse  0: forward; 1: from the target to the source
 * @param count    number of points
 * @param in       not changed, unless it is out
 * @param out      may be in; a point that fails becomes NaN
 * @param status   a word for each point, or null
 * @param threads  how many at most; 0: as many as there are cores
 * @return how many points failed
 */
TW_SYSTEMS_C_API size_t tw_transform(const tw_transformation* transformation, int32_t inverse,
                                     size_t count, const tw_points* in, const tw_points* out,
                                     TWstatus* status, uint32_t threads);
/** The same in single precision. */
TW_SYSTEMS_C_API size_t tw_transform_f(const tw_transformation* transformation, int32_t inverse,
                                       size_t count, const tw_points_f* in, const tw_points_f* out,
                                       TWstatus* status, uint32_t threads);

/** The steps in words, a line each. */
TW_SYSTEMS_C_API size_t tw_transformation_describe(const tw_transformation* transformation,
                                                   char* text, size_t size);
/** The datum step, as options take it; empty without one. */
TW_SYSTEMS_C_API size_t tw_transformation_operation(const tw_transformation* transformation,
                                                    char* text, size_t size);
/** Stated accuracy of the datum step in metres: 0 without one, NaN when unknown. */
TW_SYSTEMS_C_API double tw_transformation_accuracy(const tw_transformation* transformation);

/** An operation that could serve between two systems. */
typedef struct tw_candidates tw_candidates;
/** All operations that could serve, best first; options may be null. */
TW_SYSTEMS_C_API tw_candidates* tw_candidates_create(const tw_system* source,
                                                     const tw_system* target,
                                                     const tw_transformation_options* options);
/** Takes a list back. */
TW_SYSTEMS_C_API void tw_candidates_destroy(tw_candidates* candidates);
/** How many there are. */
TW_SYSTEMS_C_API size_t tw_candidates_count(const tw_candidates* candidates);
/** Steps as options take them, for number i from 0; the others likewise. */
TW_SYSTEMS_C_API size_t tw_candidate_operation(const tw_candidates* candidates, size_t i,
                                               char* text, size_t size);
/** The names of its steps in the registry. */
TW_SYSTEMS_C_API size_t tw_candidate_name(const tw_candidates* candidates, size_t i, char* text,
                                          size_t size);
/** Stated accuracy in metres; NaN when unknown. */
TW_SYSTEMS_C_API double tw_candidate_accuracy(const tw_candidates* candidates, size_t i);
/** What hinders its use; empty where nothing does. */
TW_SYSTEMS_C_API size_t tw_candidate_missing(const tw_candidates* candidates, size_t i, char* text,
                                             size_t size);
/** @} */

/** @name Projections
 *  @{ */

/** A Projection. */
typedef struct tw_projection tw_projection;

/**
 * A projection by method and named parameters, as Projection takes them; degrees, metres.
 * @param method              the method, as Projection takes it
 * @param count               number of parameters
 * @param names               count names of parameters
 * @param values              count values
 * @param a                   semi-major axis, metres
 * @param inverse_flattening  0 for a sphere
 */
TW_SYSTEMS_C_API tw_projection* tw_projection_create(const char* method, size_t count,
                                                     const char* const* names, const double* values,
                                                     double a, double inverse_flattening);
/** The projection of a projected system, without its unit; null for other systems. */
TW_SYSTEMS_C_API tw_projection* tw_projection_of(const tw_system* system);
/** Takes a projection back. */
TW_SYSTEMS_C_API void tw_projection_destroy(tw_projection* projection);

/** Degrees to metres, or back; as tw_transform(). */
TW_SYSTEMS_C_API size_t tw_project(const tw_projection* projection, int32_t inverse, size_t count,
                                   const tw_points* in, const tw_points* out, TWstatus* status,
                                   uint32_t threads);

/** How a projection distorts at a point. */
typedef struct tw_factors {
  double meridional;  /**< scale along the meridian */
  double parallel;    /**< scale along the parallel */
  double areal;       /**< scale of areas */
  double convergence; /**< bearing of grid north from true north, degrees, clockwise positive */
  double angular;     /**< largest angular distortion, degrees */
} tw_factors;

/** Distortion at points in degrees, NaN where there is none; as tw_transform(). */
TW_SYSTEMS_C_API size_t tw_project_factors(const tw_projection* projection, size_t count,
                                           const tw_points* in, tw_factors* out, TWstatus* status);

/** Number of methods, and the name of number i from 0. */
TW_SYSTEMS_C_API size_t tw_projection_method_count(void);
/** The name of method i from 0. */
TW_SYSTEMS_C_API size_t tw_projection_method(size_t i, char* text, size_t size);
/** @} */

/** @name Angles, positions and grid references as people write them
 *  @{ */

/**
 * Reads an angle as parse_angle() does.
 * @param text           UTF-8
 * @param axis           0: longitude or latitude, 1: longitude, 2: latitude
 * @param decimal_comma  not 0: the comma is a decimal mark
 * @param degrees        the angle, east and north positive; unwritten on failure
 * @return 1, or 0 with the reason in tw_last_error()
 */
TW_SYSTEMS_C_API int32_t tw_parse_angle(const char* text, int32_t axis, int32_t decimal_comma,
                                        double* degrees);
/**
 * Reads a position as parse_position() does.
 * @param text           UTF-8
 * @param decimal_comma  not 0: the comma is a decimal mark
 * @param order     0: refused where the text does not tell, 1: longitude first, 2: latitude first
 * @param position  longitude, latitude in degrees, height in metres (NaN without one);
 *                  unwritten on failure
 * @return 1, or 0 with the reason in tw_last_error()
 */
TW_SYSTEMS_C_API int32_t tw_parse_position(const char* text, int32_t order, int32_t decimal_comma,
                                           double position[3]);
/**
 * The point of a military grid reference, the centre of its square.
 * @param text      the reference, UTF-8
 * @param position  longitude, latitude in degrees on WGS 84; unwritten on failure
 * @return 1, or 0 with the reason in tw_last_error()
 */
TW_SYSTEMS_C_API int32_t tw_parse_mgrs(const char* text, double position[2]);
/**
 * The military grid reference of the square that holds a point.
 * @param longitude,latitude  degrees on WGS 84
 * @param digits  0 to 11 of easting and northing each
 * @param text    size places, or null
 * @param size    of the buffer
 * @return the length; 0 where the point has none
 */
TW_SYSTEMS_C_API size_t tw_format_mgrs(double longitude, double latitude, int32_t digits,
                                       char* text, size_t size);
/** @} */

/** @name Lines on the ellipsoid: geodesics and rhumb lines
 *
 *  Degrees, and lengths in the unit of a.  What is not wanted may be null.
 *  @{ */

/** A Geodesic or a Rhumb. */
typedef struct tw_lines tw_lines;

/**
 * @param rhumb  0: geodesics; else rhumb lines
 * @param a      semi-major axis
 * @param f      flattening, from -0.01 to 0.01
 */
TW_SYSTEMS_C_API tw_lines* tw_lines_create(int32_t rhumb, double a, double f);
/** Takes lines back. */
TW_SYSTEMS_C_API void tw_lines_destroy(tw_lines* lines);
/** Where lines lead; how many have no end. */
TW_SYSTEMS_C_API size_t tw_lines_direct(const tw_lines* lines, size_t count, const double* lon,
                                        const double* lat, const double* azimuth,
                                        const double* length, double* end_lon, double* end_lat,
                                        double* end_azimuth);
/** Lines between points; how many have none. */
TW_SYSTEMS_C_API size_t tw_lines_inverse(const tw_lines* lines, size_t count, const double* lon1,
                                         const double* lat1, const double* lon2, const double* lat2,
                                         double* length, double* azimuth1, double* azimuth2);
/** Perimeter, and area counterclockwise positive, of a polygon. */
TW_SYSTEMS_C_API void tw_lines_polygon(const tw_lines* lines, size_t count, const double* lon,
                                       const double* lat, double* perimeter, double* area);
/** @} */

/** @name The Earth's magnetic field
 *  @{ */

/** A MagneticModel. */
typedef struct tw_magnetic_model tw_magnetic_model;

/**
 * @param name  the model's name in the store; null or empty for the newest
 * @param year  decimal year
 * @return null where the store has no such model, or the model no field at that date
 */
TW_SYSTEMS_C_API tw_magnetic_model* tw_magnetic_model_create(const char* name, double year);
/** Takes a model back. */
TW_SYSTEMS_C_API void tw_magnetic_model_destroy(tw_magnetic_model* model);
/** Its name in the store. */
TW_SYSTEMS_C_API size_t tw_magnetic_model_name(const tw_magnetic_model* model, char* text,
                                               size_t size);

/** Components and intensities in nanotesla, angles in degrees; then the yearly change of each. */
typedef struct tw_magnetic_value {
  double north, east, down, horizontal, total, declination, inclination;
  double yearly_north, yearly_east, yearly_down, yearly_horizontal, yearly_total;
  double yearly_declination, yearly_inclination;
} tw_magnetic_value;

/** The field at points of degrees and metres above WGS 84, NaN for one that fails; as
 *  tw_transform(). */
TW_SYSTEMS_C_API size_t tw_magnetic_field(const tw_magnetic_model* model, size_t count,
                                          const tw_points* in, tw_magnetic_value* out,
                                          TWstatus* status);
/** @} */

#ifdef __cplusplus
}
#endif

#endif
