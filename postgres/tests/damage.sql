-- Rows of garbage in the place of a geometry: an error each, and never the end of the server.
\ir checks.sql
CREATE FUNCTION raw_transform(bytea, text, text) RETURNS bytea
  AS '$libdir/tidewater', 'tidewater_transform_geometry' LANGUAGE C STRICT;
CREATE FUNCTION raw_length(bytea) RETURNS double precision
  AS '$libdir/tidewater', 'tidewater_geodesic_length_geometry' LANGUAGE C STRICT;

SELECT check_that('short: ' || size, failure(format(
  'SELECT raw_transform(%L, ''EPSG:4326'', ''EPSG:2154'')', repeat('\000', size)::bytea))
  LIKE 'XX001 %') FROM generate_series(0, 11) AS size;
-- A thousand rows of random bytes, some with a plausible head.
SELECT setseed(0.25);
CREATE TABLE garbage AS SELECT decode(
    CASE WHEN i % 2 = 0 THEN '0010e640' || lpad(to_hex(1 + i % 16), 2, '0') || '000000'
      || lpad(to_hex(i % 5), 2, '0') || CASE WHEN i % 7 = 0 THEN 'ffffff' ELSE '000000' END
    ELSE '' END || string_agg(md5(random()::text), ''), 'hex') AS bytes
  FROM generate_series(1, 1000) AS i, generate_series(1, 5) GROUP BY i;
SELECT check_that('garbage is answered', count(*) = 1000) FROM (
  SELECT failure(format('SELECT raw_transform(%L, ''EPSG:4326'', ''EPSG:2154''), raw_length(%L)',
    bytes, bytes)) AS answer FROM garbage) AS answers
  WHERE answer LIKE 'XX001 %' OR answer = 'no failure';
-- Collections within collections, deeper than the stack.
SELECT check_that('a deep nest is refused', failure(format(
  'SELECT raw_length(%L)', ('\x0010e640'::bytea || decode(repeat('0700000001000000', 2000000), 'hex'))))
  LIKE '54001 %');
SELECT check_that('and the session goes on', tw_transform(2, 48, 'EPSG:4326', 'EPSG:2154') IS NOT NULL);
