-- What the tests share: a line for each thing that holds, and an error for the first that does not.
CREATE OR REPLACE FUNCTION check_that(what text, holds boolean) RETURNS text LANGUAGE plpgsql AS $$
BEGIN
  IF holds IS NOT TRUE THEN RAISE EXCEPTION 'failed: %', what; END IF;
  RETURN 'ok ' || what;
END $$;
-- The SQLSTATE and sentence with which a statement fails.
CREATE OR REPLACE FUNCTION failure(statement text) RETURNS text LANGUAGE plpgsql AS $$
BEGIN
  EXECUTE statement;
  RETURN 'no failure';
EXCEPTION WHEN OTHERS THEN
  RETURN SQLSTATE || ' ' || SQLERRM;
END $$;
