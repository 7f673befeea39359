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

-- Processor time of this session: what else runs on the machine does not count.
CREATE FUNCTION seconds_so_far() RETURNS float8 LANGUAGE sql VOLATILE AS $$
  SELECT split_part(pg_read_file('/proc/self/schedstat'), ' ', 1)::float8 / 1e9 $$;
CREATE FUNCTION seconds(statement text) RETURNS float8 LANGUAGE plpgsql AS $$
DECLARE
  begun float8;
  best float8 := 'infinity';
BEGIN
  FOR i IN 1 .. 5 LOOP
    begun := seconds_so_far();
    EXECUTE statement;
    best := least(best, seconds_so_far() - begun);
  END LOOP;
  RETURN best;
END $$;

CREATE TABLE lines AS SELECT ST_MakeLine(array_agg(shape)) AS shape
  FROM (SELECT shape, row_number() OVER () / 100 AS line FROM points) AS numbered GROUP BY line;
VACUUM lines;
CREATE TABLE times AS SELECT what, target,
    seconds('SELECT count(ST_SRID(shape)) FROM ' || what) AS scan,
    seconds(format('SELECT count(ST_SRID(tw_transform(shape, %s))) FROM %s', target, what)) AS ours,
    seconds(format('SELECT count(ST_SRID(ST_Transform(shape, %s))) FROM %s', target, what)) AS theirs
  FROM unnest(ARRAY['points', 'lines']) AS what, unnest(ARRAY[32632, 2154, 3857, 4326]) AS target;
SELECT format('%s points in %s, EPSG:32631 to EPSG:%s: scan %s s, tw_transform %s s, '
    'ST_Transform %s s; net of the scan %s times its speed', :points,
    CASE what WHEN 'points' THEN 'rows' ELSE 'lines of 100' END, target, round(scan::numeric, 3),
    round(ours::numeric, 3), round(theirs::numeric, 3),
    round(((theirs - scan) / (ours - scan))::numeric, 1)) FROM times;
