\echo Use "CREATE EXTENSION tidewater" to load this file. \quit

CREATE FUNCTION tw_version() RETURNS text
  AS 'MODULE_PATHNAME', 'tidewater_version' LANGUAGE C IMMUTABLE STRICT PARALLEL SAFE;

-- Which operation is best depends on the grids that are installed: STABLE, not IMMUTABLE.
CREATE FUNCTION tw_transform(x double precision, y double precision, source text, target text)
  RETURNS point
  AS 'MODULE_PATHNAME', 'tidewater_transform_xy' LANGUAGE C STABLE STRICT PARALLEL SAFE COST 20;
COMMENT ON FUNCTION tw_transform(double precision, double precision, text, text) IS
  'A point from one system to another: longitude or easting first, degrees; NULL where it has no result';

CREATE FUNCTION tw_transform(INOUT x double precision, INOUT y double precision,
    INOUT z double precision, source text, target text)
  AS 'MODULE_PATHNAME', 'tidewater_transform_xyz' LANGUAGE C STABLE STRICT PARALLEL SAFE COST 20;
COMMENT ON FUNCTION tw_transform(double precision, double precision, double precision, text, text) IS
  'A point with its height in metres, as a row x, y, z';

CREATE FUNCTION tw_describe(source text, target text) RETURNS text
  AS 'MODULE_PATHNAME', 'tidewater_describe' LANGUAGE C STABLE STRICT PARALLEL SAFE;
COMMENT ON FUNCTION tw_describe(text, text) IS
  'The steps from one system to another in words, with their accuracy';

CREATE FUNCTION tw_geodesic_length(lon1 double precision, lat1 double precision,
    lon2 double precision, lat2 double precision) RETURNS double precision
  AS 'MODULE_PATHNAME', 'tidewater_geodesic_length' LANGUAGE C IMMUTABLE STRICT PARALLEL SAFE COST 20;
COMMENT ON FUNCTION tw_geodesic_length(double precision, double precision, double precision,
    double precision) IS
  'Metres of the shortest line between two points of WGS 84 in degrees';

-- The coefficients come from the store.
CREATE FUNCTION tw_declination(lon double precision, lat double precision, year double precision,
    height double precision DEFAULT 0, model text DEFAULT '') RETURNS double precision
  AS 'MODULE_PATHNAME', 'tidewater_declination' LANGUAGE C STABLE STRICT PARALLEL SAFE COST 100;
COMMENT ON FUNCTION tw_declination(double precision, double precision, double precision,
    double precision, text) IS
  'Magnetic declination in degrees east of true north, at a decimal year';

-- With PostGIS in the database its geometry is served as well.
CREATE PROCEDURE tw_serve_postgis() LANGUAGE plpgsql AS $procedure$
DECLARE
  home text := (SELECT n.nspname FROM pg_extension e JOIN pg_namespace n ON n.oid = e.extnamespace
                WHERE e.extname = 'postgis');
  own text := (SELECT n.nspname FROM pg_extension e JOIN pg_namespace n ON n.oid = e.extnamespace
               WHERE e.extname = 'tidewater');
  library text := '$libdir/tidewater';
BEGIN
  IF home IS NULL THEN
    RAISE EXCEPTION 'PostGIS is not in this database' USING ERRCODE = 'undefined_object',
      HINT = 'CREATE EXTENSION postgis; then CALL tw_serve_postgis();';
  END IF;
  EXECUTE format($sql$
    CREATE OR REPLACE FUNCTION %1$I.tw_transform(shape %2$I.geometry, target integer)
      RETURNS %2$I.geometry AS %3$L, 'tidewater_transform_code'
      LANGUAGE C STABLE STRICT PARALLEL SAFE COST 100;
    CREATE OR REPLACE FUNCTION %1$I.tw_transform(shape %2$I.geometry, target text)
      RETURNS %2$I.geometry AS %3$L, 'tidewater_transform_own'
      LANGUAGE C STABLE STRICT PARALLEL SAFE COST 100;
    CREATE OR REPLACE FUNCTION %1$I.tw_transform(shape %2$I.geometry, source text, target text)
      RETURNS %2$I.geometry AS %3$L, 'tidewater_transform_geometry'
      LANGUAGE C STABLE STRICT PARALLEL SAFE COST 100;
    CREATE OR REPLACE FUNCTION %1$I.tw_geodesic_length(shape %2$I.geometry)
      RETURNS double precision AS %3$L, 'tidewater_geodesic_length_geometry'
      LANGUAGE C IMMUTABLE STRICT PARALLEL SAFE COST 100;
  $sql$, own, home, library);
END
$procedure$;
COMMENT ON PROCEDURE tw_serve_postgis() IS
  'Makes the functions on geometry, where PostGIS came into the database after this extension';

DO $do$
BEGIN
  IF EXISTS (SELECT FROM pg_extension WHERE extname = 'postgis') THEN
    CALL tw_serve_postgis();
  END IF;
END
$do$;
