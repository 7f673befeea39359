/* Tidewater in PostgreSQL: functions on numbers and on PostGIS's geometry.
 *
 * What is named wrongly is an error of the statement; a point that has no result is NULL.  Nothing
 * here throws, starts a thread or keeps more than a few objects for the life of a session. */
#include "postgres.h"

#include <math.h>

#include "fmgr.h"
#include "funcapi.h"
#include "miscadmin.h"
#include "tidewater/systems.h"
#include "utils/builtins.h"
#include "utils/geo_decls.h"

PG_MODULE_MAGIC;

/* ---- objects of a session ---- */

/* A system as it was asked for: by a text, or, without one, by its code. */
typedef struct SystemName {
  const char* text; /* null: the code alone */
  size_t size;
  int32 code;
} SystemName;

/* A transformation by the names of its systems; the latest used stands first. */
typedef struct Known {
  SystemName from;
  SystemName to;
  tw_transformation* transformation;
  int32 code; /* of the target system, 0 without one */
} Known;

enum { MOST_KNOWN = 16 };

static Known known[MOST_KNOWN];
static int known_count = 0;

static void refuse(void) {
  ereport(ERROR, (errcode(ERRCODE_INVALID_PARAMETER_VALUE), errmsg("%s", tw_last_error())));
}

static void to_front(int at) {
  Known found = known[at];
  memmove(known + 1, known, (size_t)at * sizeof(Known));
  known[0] = found;
}

static bool same_name(const SystemName* kept, const SystemName* name) {
  if (kept->text == NULL || name->text == NULL) {
    return kept->text == name->text && kept->code == name->code;
  }
  return kept->size == name->size && memcmp(kept->text, name->text, name->size) == 0;
}

static SystemName by_text(text* given) {
  SystemName name = {VARDATA_ANY(given), VARSIZE_ANY_EXHDR(given), 0};
  return name;
}

static SystemName by_code(int32 code) {
  SystemName name = {NULL, 0, code};
  return name;
}

static tw_system* system_named(const SystemName* name) {
  char code[32];
  pg_snprintf(code, sizeof code, "EPSG:%d", name->code);
  return tw_system_create(name->text == NULL ? code : pnstrdup(name->text, name->size));
}

/* A name that lives as long as the session. */
static SystemName kept(SystemName name) {
  if (name.text != NULL) {
    char* copy = MemoryContextAlloc(TopMemoryContext, name.size + 1);
    memcpy(copy, name.text, name.size);
    name.text = copy;
  }
  return name;
}

static void forget(SystemName name) {
  if (name.text != NULL) pfree((char*)name.text);
}

static const Known* transformation_between(SystemName from, SystemName to) {
  for (int i = 0; i < known_count; ++i) {
    if (same_name(&known[i].from, &from) && same_name(&known[i].to, &to)) {
      if (i > 0) to_front(i);
      return &known[0];
    }
  }
  Known made = {kept(from), kept(to), NULL, 0};
  tw_system* source = system_named(&from);
  tw_system* target = source == NULL ? NULL : system_named(&to);
  if (target != NULL) {
    made.transformation = tw_transformation_create(source, target, NULL);
    made.code = tw_system_code(target);
  }
  tw_system_destroy(source);
  tw_system_destroy(target);
  if (made.transformation == NULL) {
    forget(made.from);
    forget(made.to);
    refuse();
  }
  if (known_count == MOST_KNOWN) {
    Known* last = &known[--known_count];
    tw_transformation_destroy(last->transformation);
    forget(last->from);
    forget(last->to);
  }
  known[known_count++] = made;
  to_front(known_count - 1);
  return &known[0];
}

static const Known* transformation_of(text* from, text* to) {
  return transformation_between(by_text(from), by_text(to));
}

/* Geodesics of the ellipsoid of the last system that was asked for. */
static tw_lines* geodesics_on(double a, double f) {
  static tw_lines* lines = NULL;
  static double known_a, known_f;
  if (lines == NULL || a != known_a || f != known_f) {
    tw_lines* made = tw_lines_create(0, a, f);
    if (made == NULL) refuse();
    tw_lines_destroy(lines);
    lines = made;
    known_a = a;
    known_f = f;
  }
  return lines;
}

static const double WGS84_A = 6378137;
static const double WGS84_F = 1 / 298.257223563;

/* ---- functions on numbers ---- */

PG_FUNCTION_INFO_V1(tidewater_version);
Datum tidewater_version(PG_FUNCTION_ARGS) { PG_RETURN_TEXT_P(cstring_to_text(tw_version())); }

PG_FUNCTION_INFO_V1(tidewater_transform_xy);
Datum tidewater_transform_xy(PG_FUNCTION_ARGS) {
  const Known* way = transformation_of(PG_GETARG_TEXT_PP(2), PG_GETARG_TEXT_PP(3));
  Point* point = palloc(sizeof(Point));
  point->x = PG_GETARG_FLOAT8(0);
  point->y = PG_GETARG_FLOAT8(1);
  tw_points points = {&point->x, &point->y, NULL, 1};
  if (tw_transform(way->transformation, 0, 1, &points, &points, NULL, 1) > 0) PG_RETURN_NULL();
  PG_RETURN_POINT_P(point);
}

PG_FUNCTION_INFO_V1(tidewater_transform_xyz);
Datum tidewater_transform_xyz(PG_FUNCTION_ARGS) {
  const Known* way = transformation_of(PG_GETARG_TEXT_PP(3), PG_GETARG_TEXT_PP(4));
  double x = PG_GETARG_FLOAT8(0), y = PG_GETARG_FLOAT8(1), z = PG_GETARG_FLOAT8(2);
  tw_points points = {&x, &y, &z, 1};
  if (tw_transform(way->transformation, 0, 1, &points, &points, NULL, 1) > 0) PG_RETURN_NULL();
  TupleDesc row;
  if (get_call_result_type(fcinfo, NULL, &row) != TYPEFUNC_COMPOSITE) {
    ereport(ERROR, (errcode(ERRCODE_FEATURE_NOT_SUPPORTED),
                    errmsg("the three coordinates must be taken as a row")));
  }
  Datum values[3] = {Float8GetDatum(x), Float8GetDatum(y), Float8GetDatum(z)};
  bool nulls[3] = {false, false, false};
  PG_RETURN_DATUM(HeapTupleGetDatum(heap_form_tuple(BlessTupleDesc(row), values, nulls)));
}

PG_FUNCTION_INFO_V1(tidewater_describe);
Datum tidewater_describe(PG_FUNCTION_ARGS) {
  const Known* way = transformation_of(PG_GETARG_TEXT_PP(0), PG_GETARG_TEXT_PP(1));
  size_t size = tw_transformation_describe(way->transformation, NULL, 0);
  char* words = palloc(size + 1);
  tw_transformation_describe(way->transformation, words, size + 1);
  PG_RETURN_TEXT_P(cstring_to_text(words));
}

PG_FUNCTION_INFO_V1(tidewater_geodesic_length);
Datum tidewater_geodesic_length(PG_FUNCTION_ARGS) {
  double lon1 = PG_GETARG_FLOAT8(0), lat1 = PG_GETARG_FLOAT8(1);
  double lon2 = PG_GETARG_FLOAT8(2), lat2 = PG_GETARG_FLOAT8(3);
  double length;
  if (tw_lines_inverse(geodesics_on(WGS84_A, WGS84_F), 1, &lon1, &lat1, &lon2, &lat2, &length, NULL,
                       NULL) > 0) {
    PG_RETURN_NULL();
  }
  PG_RETURN_FLOAT8(length);
}

/* A model at the last year that was asked for. */
static tw_magnetic_model* magnetic_model(const char* name, double year) {
  static tw_magnetic_model* model = NULL;
  static char known_name[64];
  static double known_year;
  if (model == NULL || year != known_year || strcmp(name, known_name) != 0) {
    tw_magnetic_model* made = tw_magnetic_model_create(name, year);
    if (made == NULL) refuse();
    tw_magnetic_model_destroy(model);
    model = made;
    known_year = year;
    if (strlcpy(known_name, name, sizeof known_name) >= sizeof known_name) known_name[0] = 1;
  }
  return model;
}

PG_FUNCTION_INFO_V1(tidewater_declination);
Datum tidewater_declination(PG_FUNCTION_ARGS) {
  double lon = PG_GETARG_FLOAT8(0), lat = PG_GETARG_FLOAT8(1), height = PG_GETARG_FLOAT8(3);
  char* name = text_to_cstring(PG_GETARG_TEXT_PP(4));
  tw_points points = {&lon, &lat, &height, 1};
  tw_magnetic_value value;
  size_t failed =
      tw_magnetic_field(magnetic_model(name, PG_GETARG_FLOAT8(2)), 1, &points, &value, NULL);
  pfree(name);
  if (failed > 0) PG_RETURN_NULL();
  PG_RETURN_FLOAT8(value.declination);
}

/* ---- PostGIS's geometry, as it stands in a row ----
 *
 * A length word; three bytes of system code; a byte of flags; perhaps eight bytes of more flags and
 * a box of floats; then shapes within shapes, each a type, counts, and coordinates as doubles. */

enum { FLAG_Z = 1, FLAG_M = 2, FLAG_BOX = 4, FLAG_GEODETIC = 8, FLAG_MORE = 16, FLAG_SECOND = 64 };

typedef struct Shape {
  char* at;
  char* end;
  int axes;
  bool has_z;
} Shape;

static void damaged(void) {
  ereport(ERROR,
          (errcode(ERRCODE_DATA_CORRUPTED), errmsg("a geometry is not laid out as it must be")));
}

static uint32 next_count(Shape* shape) {
  uint32 count;
  if (shape->end - shape->at < 4) damaged();
  memcpy(&count, shape->at, 4);
  shape->at += 4;
  return count;
}

typedef bool (*OnPoints)(Shape* shape, uint32 count, void* context);

static bool on_points(Shape* shape, uint32 count, OnPoints function, void* context) {
  size_t size = (size_t)count * (size_t)shape->axes * sizeof(double);
  if ((size_t)(shape->end - shape->at) < size) damaged();
  if (count > 0 && !function(shape, count, context)) return false;
  shape->at += size;
  return true;
}

/* Hands every run of points over; false as soon as the function says so. */
static bool walk(Shape* shape, OnPoints function, void* context) {
  check_stack_depth();
  CHECK_FOR_INTERRUPTS();
  uint32 type = next_count(shape);
  uint32 count = next_count(shape);
  switch (type) {
    case 1:  /* point */
    case 2:  /* line */
    case 8:  /* arcs */
    case 14: /* triangle */
      return on_points(shape, count, function, context);
    case 3: { /* polygon: the sizes of its rings, to a multiple of eight bytes, then the rings */
      char* sizes = shape->at;
      if ((size_t)(shape->end - shape->at) / 4 < (size_t)count + count % 2) damaged();
      shape->at += 4 * ((size_t)count + count % 2);
      for (uint32 i = 0; i < count; ++i) {
        uint32 points;
        memcpy(&points, sizes + 4 * (size_t)i, 4);
        if (!on_points(shape, points, function, context)) return false;
      }
      return true;
    }
    case 4:
    case 5:
    case 6:
    case 7:
    case 9:
    case 10:
    case 11:
    case 12:
    case 13:
    case 15:
      for (uint32 i = 0; i < count; ++i) {
        if (!walk(shape, function, context)) return false;
      }
      return true;
    default:
      damaged();
  }
  return false;
}

static bool transform_points(Shape* shape, uint32 count, void* context) {
  double* first = (double*)shape->at;
  tw_points points = {first, first + 1, shape->has_z ? first + 2 : NULL, shape->axes};
  return tw_transform((const tw_transformation*)context, 0, count, &points, &points, NULL, 1) == 0;
}

/* The shapes of a geometry: where its flags and box end. */
static Shape shape_of(struct varlena* geometry) {
  Shape shape;
  char* start = (char*)geometry;
  size_t size = VARSIZE(geometry);
  if (size < 16) damaged();
  uint8 flags = ((uint8*)start)[7];
  size_t head = 8;
  shape.has_z = (flags & FLAG_Z) != 0;
  shape.axes = 2 + (flags & FLAG_Z ? 1 : 0) + (flags & FLAG_M ? 1 : 0);
  if ((flags & FLAG_SECOND) && (flags & FLAG_MORE)) head += 8;
  if (flags & FLAG_BOX)
    head += (size_t)(flags & FLAG_GEODETIC ? 3 : shape.axes) * 2 * sizeof(float);
  if (size < head + 8) damaged();
  shape.at = start + head;
  shape.end = start + size;
  return shape;
}

static int32 code_of(const struct varlena* geometry) {
  const uint8* bytes = (const uint8*)geometry + 4;
  int32 code = bytes[0] << 16 | bytes[1] << 8 | bytes[2];
  return (int32)((uint32)code << 11) >> 11; /* 21 bits, with their sign */
}

/* A geometry that is the caller's own, brought to another system where it stands; null where a
 * point has no result.  Its box is left out: whoever needs one works it out. */
static struct varlena* transformed(struct varlena* geometry, const Known* way) {
  Shape shape = shape_of(geometry);
  size_t body = (size_t)(shape.end - shape.at);
  uint8* bytes = (uint8*)geometry + 4;
  size_t head = (bytes[3] & FLAG_SECOND) && (bytes[3] & FLAG_MORE) ? 16 : 8;
  bytes[0] = (uint8)(way->code >> 16 & 31);
  bytes[1] = (uint8)(way->code >> 8);
  bytes[2] = (uint8)way->code;
  bytes[3] = (uint8)(bytes[3] & ~FLAG_BOX);
  memmove((char*)geometry + head, shape.at, body);
  SET_VARSIZE(geometry, head + body);
  shape.at = (char*)geometry + head;
  shape.end = shape.at + body;
  return walk(&shape, transform_points, way->transformation) ? geometry : NULL;
}

static int32 own_code(const struct varlena* geometry) {
  int32 code = code_of(geometry);
  if (code <= 0) {
    ereport(ERROR, (errcode(ERRCODE_INVALID_PARAMETER_VALUE), errmsg("the geometry has no system"),
                    errhint("Give it one with ST_SetSRID, or name the system it is in.")));
  }
  return code;
}

static Datum answer(struct varlena* geometry, FunctionCallInfo fcinfo) {
  if (geometry == NULL) PG_RETURN_NULL();
  PG_RETURN_POINTER(geometry);
}

/* (geometry, from, to) */
PG_FUNCTION_INFO_V1(tidewater_transform_geometry);
Datum tidewater_transform_geometry(PG_FUNCTION_ARGS) {
  const Known* way = transformation_of(PG_GETARG_TEXT_PP(1), PG_GETARG_TEXT_PP(2));
  return answer(transformed(PG_DETOAST_DATUM_COPY(PG_GETARG_DATUM(0)), way), fcinfo);
}

/* (geometry, to): from the system of the geometry's own code. */
PG_FUNCTION_INFO_V1(tidewater_transform_own);
Datum tidewater_transform_own(PG_FUNCTION_ARGS) {
  struct varlena* geometry = PG_DETOAST_DATUM_COPY(PG_GETARG_DATUM(0));
  const Known* way =
      transformation_between(by_code(own_code(geometry)), by_text(PG_GETARG_TEXT_PP(1)));
  return answer(transformed(geometry, way), fcinfo);
}

/* (geometry, code) */
PG_FUNCTION_INFO_V1(tidewater_transform_code);
Datum tidewater_transform_code(PG_FUNCTION_ARGS) {
  struct varlena* geometry = PG_DETOAST_DATUM_COPY(PG_GETARG_DATUM(0));
  const Known* way =
      transformation_between(by_code(own_code(geometry)), by_code(PG_GETARG_INT32(1)));
  return answer(transformed(geometry, way), fcinfo);
}

typedef struct Length {
  tw_lines* lines;
  double sum;
} Length;

static bool add_lengths(Shape* shape, uint32 count, void* context) {
  Length* length = context;
  const double* points = (const double*)shape->at;
  for (uint32 i = 1; i < count; ++i) {
    const double* one = points + (size_t)(i - 1) * (size_t)shape->axes;
    const double* other = one + shape->axes;
    double part;
    if (tw_lines_inverse(length->lines, 1, one, one + 1, other, other + 1, &part, NULL, NULL) > 0) {
      return false;
    }
    length->sum += part;
  }
  return true;
}

/* The length of lines and of the outlines of polygons, on WGS 84. */
PG_FUNCTION_INFO_V1(tidewater_geodesic_length_geometry);
Datum tidewater_geodesic_length_geometry(PG_FUNCTION_ARGS) {
  Shape shape = shape_of(PG_DETOAST_DATUM(PG_GETARG_DATUM(0)));
  Length length = {geodesics_on(WGS84_A, WGS84_F), 0};
  if (!walk(&shape, add_lengths, &length)) PG_RETURN_NULL();
  PG_RETURN_FLOAT8(length.sum);
}
