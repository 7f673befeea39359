-- A million points beside ST_Transform: the same to a millimetre, and how long each takes.
\ir checks.sql
SET max_parallel_workers_per_gather = 0;
SELECT setseed(0.5);
CREATE UNLOGGED TABLE points AS
  SELECT ST_SetSRID(ST_MakePoint(300000 + 400000 * random(), 4800000 + 700000 * random()), 32631) AS shape
  FROM generate_series(1, :points);
ANALYZE points;
VACUUM points;

SELECT check_that('within a millimetre of ST_Transform, ' || target,
  max(ST_Distance(tw_transform(shape, target), ST_Transform(shape, target))) < 0.001)
  FROM points, unnest(ARRAY[32632, 2154, 3857, 3035]) AS target GROUP BY target;

CREATE FUNCTION seconds(statement text) RETURNS float8 LANGUAGE plpgsql AS $$
DECLARE
  begun timestamptz;
  best float8 := 'infinity';
BEGIN
  FOR i IN 1 .. 3 LOOP
    begun := clock_timestamp();
    EXECUTE statement;
    best := least(best, extract(epoch FROM clock_timestamp() - begun));
  END LOOP;
  RETURN best;
END $$;

CREATE TABLE times AS SELECT target,
    seconds('SELECT count(ST_X(shape)) FROM points') AS scan,
    seconds(format('SELECT count(ST_X(tw_transform(shape, %s))) FROM points', target)) AS ours,
    seconds(format('SELECT count(ST_X(ST_Transform(shape, %s))) FROM points', target)) AS theirs
  FROM unnest(ARRAY[32632, 2154, 3857, 4326]) AS target;
SELECT format('%s points, EPSG:32631 to EPSG:%s: scan %s s, tw_transform %s s, ST_Transform %s s, '
    'net of the scan %s times its speed', :points, target, round(scan::numeric, 3),
    round(ours::numeric, 3), round(theirs::numeric, 3),
    round(((theirs - scan) / (ours - scan))::numeric, 1)) FROM times;
