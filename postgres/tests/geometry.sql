-- PostGIS's geometry of every kind, beside ST_Transform.
\ir checks.sql
DROP EXTENSION tidewater CASCADE;
CREATE EXTENSION postgis;
CREATE EXTENSION tidewater;

CREATE TABLE kinds AS SELECT kind, ST_GeomFromText(kind, 4326) AS shape FROM unnest(ARRAY[
  'POINT(2.35 48.85)', 'POINT Z (2.35 48.85 35)', 'POINT M (2.35 48.85 7)',
  'POINT ZM (2.35 48.85 35 7)', 'POINT EMPTY', 'LINESTRING(0 45, 1 46, 2 47)',
  'LINESTRING Z (0 45 1, 1 46 2, 2 47 3)', 'LINESTRING EMPTY',
  'POLYGON((0 45, 2 45, 2 47, 0 45))',
  'POLYGON((0 45, 2 45, 2 47, 0 45), (1 45.2, 1.5 45.2, 1.5 45.4, 1 45.2))',
  'POLYGON ZM ((0 45 1 2, 2 45 3 4, 2 47 5 6, 0 45 1 2))',
  'MULTIPOINT(1 45, 2 46)', 'MULTILINESTRING((0 45, 1 46), (2 47, 3 48, 4 49))',
  'MULTIPOLYGON(((0 45, 2 45, 2 47, 0 45)), ((3 45, 4 45, 4 47, 3 45)))',
  'GEOMETRYCOLLECTION(POINT(2 48), GEOMETRYCOLLECTION(LINESTRING(0 45, 1 46), POINT EMPTY))',
  'CIRCULARSTRING(0 45, 1 46, 2 45)', 'COMPOUNDCURVE(CIRCULARSTRING(0 45, 1 46, 2 45), (2 45, 3 45))',
  'CURVEPOLYGON(CIRCULARSTRING(0 45, 1 46, 2 45, 1 44, 0 45))',
  'MULTICURVE((0 45, 1 46), CIRCULARSTRING(0 45, 1 46, 2 45))',
  'MULTISURFACE(((0 45, 2 45, 2 47, 0 45)))',
  'POLYHEDRALSURFACE(((0 45, 2 45, 2 47, 0 45)))', 'TRIANGLE((0 45, 2 45, 2 47, 0 45))',
  'TIN(((0 45, 2 45, 2 47, 0 45)))']) AS kind;

SELECT check_that('as ST_Transform: ' || kind,
  ST_SRID(moved) = 2154 AND ST_AsText(moved, 3) = ST_AsText(ST_Transform(shape, 2154), 3))
  FROM (SELECT *, tw_transform(shape, 2154) AS moved FROM kinds) AS all_kinds;
SELECT check_that('boxes are right', bool_and(ST_IsEmpty(shape) OR abs(ST_XMax(tw_transform(shape, 2154)) - ST_XMax(ST_Transform(shape, 2154))) < 0.001))
  FROM kinds;
SELECT check_that('the input is left alone', bool_and(shape = ST_GeomFromText(kind, 4326))) FROM kinds;
SELECT check_that('systems by text', ST_AsText(tw_transform(shape, 'utm:31N'), 3)
    = ST_AsText(tw_transform(shape, 32631), 3)
  AND ST_SRID(tw_transform(shape, 'EPSG:4326', 'EPSG:2154')) = 2154) FROM kinds LIMIT 1;
-- Moved by a degree, as the last digit of a longitude of 0 would be written with an exponent.
SELECT check_that('and the way back', bool_and(
  ST_AsText(ST_Translate(tw_transform(tw_transform(shape, 2154), 4326), 1, 0), 8)
    = ST_AsText(ST_Translate(shape, 1, 0), 8))) FROM kinds;
SELECT check_that('a bad point makes null',
  tw_transform(ST_GeomFromText('LINESTRING(0 45, 0 95)', 4326), 2154) IS NULL);
SELECT check_that('a shape without system', failure(
  $$SELECT tw_transform('POINT(1 2)'::geometry, 2154)$$) LIKE '22023 the geometry has no system');
SELECT check_that('a system that is none', failure(
  $$SELECT tw_transform('SRID=4326;POINT(1 2)'::geometry, 5)$$) LIKE '22023 %');
SELECT check_that('the length of lines', abs(tw_geodesic_length('LINESTRING(0 0, 45 0, 90 0)'::geometry)
  - pi() * 6378137 / 2) < 1e-7);
SELECT check_that('as ST_Length on the spheroid', bool_and(
  abs(tw_geodesic_length(shape) - ST_LengthSpheroid(shape, 'SPHEROID["WGS 84",6378137,298.257223563]')) < 1e-3))
  FROM kinds WHERE kind ~ '^(MULTI)?LINESTRING *\(';
CREATE TABLE indexed AS SELECT tw_transform(shape, 2154) AS shape FROM kinds;
CREATE INDEX ON indexed USING gist (shape);
SET enable_seqscan = off;
SELECT check_that('an index finds what was written', count(*) > 10) FROM indexed
  WHERE shape && ST_MakeEnvelope(0, 5000000, 2000000, 8000000, 2154);
