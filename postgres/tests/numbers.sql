-- Functions on numbers, without PostGIS.
\ir checks.sql
CREATE EXTENSION tidewater;

SELECT check_that('the version is told', tw_version() ~ '^\d+\.\d+\.\d+$');
-- EPSG Guidance Note 7-2, British National Grid; the Note's shorter series ends 8 mm away.
SELECT check_that('a published point', p <-> point(577274.99, 69740.50) < 0.012)
  FROM tw_transform(0.5, 50.5, 'EPSG:4277', 'EPSG:27700') AS p;
SELECT check_that('and back', p <-> point(0.5, 50.5) < 2e-7)
  FROM tw_transform(577274.99, 69740.50, 'EPSG:27700', 'EPSG:4277') AS p;
-- On the equator at the prime meridian an ellipsoid's point is a from the centre.
SELECT check_that('heights', abs(x - 6378237) < 1e-6 AND abs(y) < 1e-6 AND abs(z) < 1e-6)
  FROM tw_transform(0, 0, 100, 'EPSG:4979', 'EPSG:4978');
SELECT check_that('names and definitions serve',
  tw_transform(2, 48, 'wgs84', 'utm:31N') <-> tw_transform(2, 48, 'EPSG:4326', 'EPSG:32631') < 1e-9);
SELECT check_that('steps in words', tw_describe('EPSG:4326', 'EPSG:2154') LIKE '%Lambert%');

SELECT check_that('a point without a result is null', tw_transform(2, 95, 'EPSG:4326', 'EPSG:2154') IS NULL);
SELECT check_that('not-a-number is null', tw_transform('NaN', 48, 'EPSG:4326', 'EPSG:2154') IS NULL);
SELECT check_that('infinity is null', tw_transform('infinity', 0, 'EPSG:4326', 'EPSG:2154') IS NULL);
SELECT check_that('three axes are null at once', x IS NULL AND y IS NULL AND z IS NULL)
  FROM tw_transform(2, 95, 0, 'EPSG:4326', 'EPSG:2154');
SELECT check_that('null in, null out', tw_transform(NULL, 48, 'EPSG:4326', 'EPSG:2154') IS NULL);
SELECT check_that('a bad code is a sentence',
  failure($$SELECT tw_transform(2, 48, 'EPSG:99999', 'EPSG:2154')$$) LIKE '22023 %99999%');
SELECT check_that('a bad target likewise',
  failure($$SELECT tw_transform(2, 48, 'EPSG:4326', 'moon')$$) LIKE '22023 %moon%');
SELECT check_that('an empty name likewise',
  failure($$SELECT tw_transform(2, 48, '', 'EPSG:4326')$$) LIKE '22023 %');
SELECT check_that('a long name likewise',
  failure($$SELECT tw_transform(2, 48, repeat('(', 1000000), 'EPSG:4326')$$) LIKE '22023 %');
SELECT check_that('and the session goes on', tw_transform(2, 48, 'EPSG:4326', 'EPSG:2154') IS NOT NULL);

-- More pairs than are kept, in turn, twice over.
SELECT check_that('many systems', count(*) = 2 AND max(n) = 60)
  FROM (SELECT round, count(p) AS n FROM generate_series(1, 2) AS round,
        generate_series(1, 60) AS zone,
        tw_transform(zone * 6 - 183, 10, 'EPSG:4326', 'EPSG:' || 32600 + zone) AS p
        WHERE p <-> point(500000, 1105413) < 1000 GROUP BY round) AS rounds;

-- A quarter of the equator of WGS 84 is pi a / 2.
SELECT check_that('geodesic length', abs(tw_geodesic_length(0, 0, 90, 0) - pi() * 6378137 / 2) < 1e-8);
SELECT check_that('beyond a pole is null', tw_geodesic_length(0, 91, 90, 0) IS NULL);
-- Test values of the WMM2025 technical report.
SELECT check_that('declination', abs(tw_declination(0, 80, 2025) - 1.28) < 0.0051
  AND abs(tw_declination(240, -80, 2025, 0, 'WMM2025') - 68.78) < 0.0051);
SELECT check_that('a bad model', failure($$SELECT tw_declination(0, 0, 2025, 0, 'none')$$) LIKE '22023 %none%');
SELECT check_that('a model of a long name',
  failure($$SELECT tw_declination(0, 0, 2025, 0, repeat('x', 1000))$$) LIKE '22023 %');
SELECT check_that('a bad year', failure($$SELECT tw_declination(0, 0, 1066)$$) LIKE '22023 %');
SELECT check_that('a year that is none', failure($$SELECT tw_declination(0, 0, 'NaN')$$) LIKE '22023 %');

SELECT check_that('every function may run in parallel', bool_and(proparallel = 's'))
  FROM pg_proc WHERE proname LIKE 'tw\_%' AND prokind = 'f';
SELECT check_that('only what never changes is immutable',
  array_agg(proname::text ORDER BY proname) = '{tw_geodesic_length,tw_version}')
  FROM pg_proc WHERE proname LIKE 'tw\_%' AND provolatile = 'i';
SELECT check_that('PostGIS is asked for where it is not',
  failure('CALL tw_serve_postgis()') LIKE '42704 PostGIS is not in this database');

CREATE TABLE numbers AS SELECT i % 12 - 4.0::float8 AS lon, 42 + i % 9 * 1.0::float8 AS lat
  FROM generate_series(1, 200000) AS i;
ANALYZE numbers;
SET parallel_setup_cost = 0;
SET parallel_tuple_cost = 0;
CREATE TEMP TABLE sums (way text, s float8);
INSERT INTO sums SELECT 'parallel', sum((tw_transform(lon, lat, 'EPSG:4326', 'EPSG:2154'))[0] - 700000) FROM numbers;
SET max_parallel_workers_per_gather = 0;
INSERT INTO sums SELECT 'alone', sum((tw_transform(lon, lat, 'EPSG:4326', 'EPSG:2154'))[0] - 700000) FROM numbers;
SELECT check_that('workers give the same sum', abs(max(s) - min(s)) < 1e-3) FROM sums;
RESET max_parallel_workers_per_gather;
