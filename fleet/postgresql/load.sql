-- SPDX-License-Identifier: MIT
-- Loading: fleet.load(line, source) takes one line of vrxhost's ndjson. Lines may come again; a run that is whole takes
-- no more of them. They may come in another order; what there is of a run becomes visible when its end record arrives,
-- and once more when the last of its records does.

-- Returns: the line as jsonb. jsonb cannot hold \u0000, which some firmware pads its texts with: it becomes \ufffd, with
-- a trace in the rejects. Raises what jsonb finds wrong with anything else.
CREATE OR REPLACE FUNCTION fleet.parse(line text, source text) RETURNS jsonb LANGUAGE plpgsql SET search_path = pg_catalog AS $$
BEGIN
    RETURN line::jsonb;
EXCEPTION WHEN untranslatable_character THEN
    DECLARE
        -- an even number of backslashes before it leaves \u0000 an escape
        document jsonb := regexp_replace(line, '(?<!\\)((?:\\\\)*)\\u0000', '\1\\ufffd', 'g')::jsonb;
    BEGIN
        INSERT INTO fleet.rejects (verdict, source, code, reason, line) VALUES ('altered', source, SQLSTATE, SQLERRM, line);
        RETURN document;
    END;
END $$;

-- Raises: 22023 with a sentence when the document is not a record that this version knows.
CREATE OR REPLACE FUNCTION fleet.check_record(document jsonb) RETURNS void LANGUAGE plpgsql SET search_path = pg_catalog AS $$
DECLARE
    wrong text := CASE
        WHEN jsonb_typeof(document) <> 'object' THEN 'the line is not an object'
        WHEN document -> 'format' IS DISTINCT FROM '2' THEN
            format('format %s is not known, only 2', coalesce(left(document ->> 'format', 40), 'null'))
        WHEN coalesce(document ->> 'record', '') NOT IN ('class', 'instance', 'end') THEN
            format('a record of the kind %s is not known', coalesce(left(document ->> 'record', 40), 'null'))
        WHEN document ->> 'run' IS NULL THEN 'the record has no run; --stable leaves it out'
        END;
    member record;
BEGIN
    FOR member IN
        SELECT * FROM (VALUES ('class instance end', 'host', 'string', 255), ('class instance end', 'run', 'string', 64),
            ('class instance end', 'time', 'string', 40), ('class instance end', 'seq', 'number', 9),
            ('class instance', 'provider', 'string', 255), ('class instance', 'class', 'string', 255),
            ('class', 'properties', 'array', NULL), ('instance', 'path', 'string', NULL), ('instance', 'key', 'object', NULL),
            ('instance', 'properties', 'object', NULL), ('end', 'hostFacts', 'object', NULL),
            ('end', 'losses', 'array', NULL), ('end', 'notes', 'array', NULL), ('end', 'complete', 'boolean', NULL),
            ('end', 'classes', 'number', 9), ('end', 'instances', 'number', 9))
            AS members (kinds, name, kind, longest)
    LOOP
        EXIT WHEN wrong IS NOT NULL;
        IF position(document ->> 'record' IN member.kinds) > 0 THEN
            wrong := CASE
                WHEN jsonb_typeof(document -> member.name) IS DISTINCT FROM member.kind THEN
                    format('%s is not a JSON %s', member.name, member.kind)
                WHEN length(document ->> member.name) > member.longest THEN
                    format('%s is longer than %s characters', member.name, member.longest) END;
        END IF;
    END LOOP;
    IF wrong IS NOT NULL THEN
        RAISE invalid_parameter_value USING MESSAGE = wrong;
    END IF;
END $$;

-- Returns: the id of the class's declaration, which is stored when it is new.
CREATE OR REPLACE FUNCTION fleet.class_of(document jsonb) RETURNS integer LANGUAGE plpgsql SET search_path = pg_catalog AS $$
DECLARE
    declaration jsonb := jsonb_build_array(document -> 'provider', document -> 'class', document -> 'superclass',
                                           document -> 'properties');
    found integer;
BEGIN
    SELECT class_id INTO found FROM fleet.classes WHERE digest = md5(declaration::text)::uuid;
    IF found IS NULL THEN
        INSERT INTO fleet.classes (provider, class, superclass, properties, volatile, digest)
        VALUES (document ->> 'provider', document ->> 'class', document ->> 'superclass', document -> 'properties',
                ARRAY(SELECT each ->> 'name' FROM jsonb_array_elements(document -> 'properties') AS each
                      WHERE each -> 'volatile' = 'true' AND each ->> 'name' IS NOT NULL),
                md5(declaration::text)::uuid)
        ON CONFLICT (digest) DO UPDATE SET class = EXCLUDED.class -- another host's loader was faster
        RETURNING class_id INTO found;
    END IF;
    RETURN found;
END $$;

-- Brings the host's present instances to what the run delivered. A run that is not complete adds and changes; only a
-- complete one makes an instance that it lacks a thing of the past.
CREATE OR REPLACE FUNCTION fleet.apply(of_host text, of_run text, run_at timestamptz, is_whole boolean, is_complete boolean)
RETURNS void LANGUAGE plpgsql SET search_path = pg_catalog AS $$
DECLARE
    declarations jsonb; -- {"provider": {"class": id}}
    seen record;
    present fleet.instances;
    idents uuid[] := '{}';
BEGIN
    SELECT coalesce(jsonb_object_agg(provider, ids), '{}') INTO declarations FROM (
        SELECT record ->> 'provider' AS provider, jsonb_object_agg(record ->> 'class', fleet.class_of(record)) AS ids
        FROM fleet.inbox WHERE host = of_host AND run = of_run AND record ->> 'record' = 'class' GROUP BY 1) AS each;
    FOR seen IN
        SELECT i.seq, i.source, i.record, i.record ->> 'provider' AS provider, i.record ->> 'class' AS class,
               md5(jsonb_build_array(i.record -> 'provider', i.record -> 'class', i.record -> 'path')::text)::uuid AS ident,
               row_number() OVER (PARTITION BY i.record -> 'provider', i.record -> 'class', i.record -> 'path'
                                  ORDER BY i.seq) AS occurrence,
               c.class_id, (i.record -> 'properties') - c.volatile AS stable,
               coalesce((SELECT jsonb_object_agg(name, i.record -> 'properties' -> name) FROM unnest(c.volatile) AS name
                         WHERE i.record -> 'properties' ? name), '{}') AS volatile
        FROM fleet.inbox AS i
        LEFT JOIN fleet.classes AS c -- the run's own declaration; the last known one where that is missing
            ON c.class_id = coalesce((declarations -> (i.record ->> 'provider') ->> (i.record ->> 'class'))::integer,
                (SELECT max(class_id) FROM fleet.classes
                 WHERE provider = i.record ->> 'provider' AND class = i.record ->> 'class'))
        WHERE i.host = of_host AND i.run = of_run AND i.record ->> 'record' = 'instance' ORDER BY i.seq
    LOOP
        IF seen.class_id IS NULL OR seen.occurrence > 1 THEN
            IF is_whole THEN
                INSERT INTO fleet.rejects (verdict, source, reason, line) VALUES (
                    CASE WHEN seen.class_id IS NULL THEN 'refused' ELSE 'duplicate' END, seen.source,
                    CASE WHEN seen.class_id IS NULL THEN 'the run has no record of the class'
                         ELSE 'an earlier instance of the run has the same path' END, seen.record::text);
            END IF;
            CONTINUE;
        END IF;
        idents := idents || seen.ident;
        SELECT * INTO present FROM fleet.instances WHERE host = of_host AND ident = seen.ident AND until IS NULL;
        IF FOUND AND present.properties = seen.stable THEN
            IF present.volatile <> seen.volatile OR present.class_id <> seen.class_id THEN
                UPDATE fleet.instances SET volatile = seen.volatile, class_id = seen.class_id
                WHERE host = of_host AND ident = seen.ident AND until IS NULL;
            END IF;
            CONTINUE;
        END IF;
        UPDATE fleet.instances SET until = run_at WHERE host = of_host AND ident = seen.ident AND until IS NULL;
        INSERT INTO fleet.instances (host, ident, class_id, provider, class, path, key, properties, volatile, since)
        VALUES (of_host, seen.ident, seen.class_id, seen.provider, seen.class, seen.record ->> 'path', seen.record -> 'key',
                seen.stable, seen.volatile, run_at);
    END LOOP;
    IF is_complete THEN
        UPDATE fleet.instances SET until = run_at WHERE host = of_host AND until IS NULL AND ident <> ALL (idents);
    END IF;
END $$;

-- Drops from the inbox what is left of a host's runs up to a time; of those that lack records a trace stays.
CREATE OR REPLACE FUNCTION fleet.clear_inbox(of_host text, run_at timestamptz) RETURNS void LANGUAGE sql
SET search_path = pg_catalog AS $$
    INSERT INTO fleet.rejects (verdict, reason, line)
        SELECT 'expired', format('%s of %s records of host %s, run %s never arrived', expected - arrived, expected, host, run), ''
        FROM fleet.runs WHERE host = of_host AND at < run_at AND NOT is_whole
        AND EXISTS (SELECT FROM fleet.inbox AS i WHERE i.host = of_host AND i.run = runs.run);
    DELETE FROM fleet.inbox AS i USING fleet.runs AS r
        WHERE i.host = of_host AND r.host = of_host AND r.run = i.run AND (r.is_whole OR r.at < run_at);
$$;

-- Closes a run: counts what arrived and applies it, unless a newer run was here first.
CREATE OR REPLACE FUNCTION fleet.finish(document jsonb) RETURNS void LANGUAGE plpgsql SET search_path = pg_catalog AS $$
DECLARE
    of_host text := document ->> 'host';
    of_run text := document ->> 'run';
    run_at timestamptz := least((document ->> 'time')::timestamptz, now()); -- of a clock that is ahead
    expected integer := (document ->> 'classes')::integer + (document ->> 'instances')::integer;
    arrived integer;
    counts jsonb;
    newest timestamptz;
    run_state text;
BEGIN
    INSERT INTO fleet.hosts (host, first_seen, last_seen, last_state) VALUES (of_host, run_at, run_at, 'partial')
    ON CONFLICT DO NOTHING;
    SELECT last_seen INTO newest FROM fleet.hosts WHERE host = of_host FOR UPDATE;
    SELECT coalesce(sum(records), 0), coalesce(jsonb_object_agg(provider, instances), '{}') INTO arrived, counts FROM (
        SELECT record ->> 'provider' AS provider, count(*) AS records,
               count(*) FILTER (WHERE record ->> 'record' = 'instance') AS instances
        FROM fleet.inbox WHERE host = of_host AND run = of_run AND record ->> 'record' <> 'end' GROUP BY 1) AS each;
    run_state := CASE WHEN newest > run_at THEN 'late'
                      WHEN arrived = expected AND (document ->> 'complete')::boolean THEN 'complete'
                      ELSE 'partial' END;
    IF run_state <> 'late' THEN
        PERFORM fleet.apply(of_host, of_run, run_at, arrived = expected, run_state = 'complete');
        UPDATE fleet.hosts SET name = document -> 'hostFacts' ->> 'name', product = document -> 'hostFacts' ->> 'product',
            serial = document -> 'hostFacts' ->> 'serial', last_seen = run_at, last_state = run_state,
            last_complete = CASE run_state WHEN 'complete' THEN run_at ELSE last_complete END
        WHERE host = of_host;
    END IF;
    INSERT INTO fleet.runs (host, run, at, state, is_whole, expected, arrived, instances, losses, notes)
    VALUES (of_host, of_run, run_at, run_state, arrived = expected, expected, arrived, counts,
            document -> 'losses', document -> 'notes')
    ON CONFLICT (host, run) DO UPDATE SET at = EXCLUDED.at, state = EXCLUDED.state, is_whole = EXCLUDED.is_whole,
        arrived = EXCLUDED.arrived, instances = EXCLUDED.instances, loaded_at = EXCLUDED.loaded_at;
    PERFORM fleet.clear_inbox(of_host, run_at);
END $$;

-- Puts a record into the inbox, and closes its run when it is the end, or the last one that the end was waiting for.
CREATE OR REPLACE FUNCTION fleet.take(document jsonb, source text) RETURNS void LANGUAGE plpgsql SET search_path = pg_catalog AS $$
DECLARE
    of_host text := document ->> 'host';
    of_run text := document ->> 'run';
    closed fleet.runs;
BEGIN
    SELECT * INTO closed FROM fleet.runs WHERE host = of_host AND run = of_run;
    IF closed.is_whole THEN
        RETURN; -- it came again
    END IF;
    INSERT INTO fleet.inbox (host, run, seq, record, source)
    VALUES (of_host, of_run, (document ->> 'seq')::integer, document, source)
    ON CONFLICT (host, run, seq) DO UPDATE SET record = EXCLUDED.record;
    IF document ->> 'record' = 'end' THEN
        PERFORM fleet.finish(document);
    ELSIF closed.run IS NOT NULL THEN
        IF closed.expected < (SELECT count(*) FROM fleet.inbox WHERE host = of_host AND run = of_run) THEN
            PERFORM fleet.finish(record) FROM fleet.inbox WHERE host = of_host AND run = of_run AND record ->> 'record' = 'end';
        END IF;
    END IF;
END $$;

-- Loads one line. What is wrong with the line itself goes to the rejects; a failure of the database (its disk, a lock,
-- its shutdown) is raised, so that the shipper keeps the line and tries again.
-- bytes: the line's length before the shipper left out NUL, which no text of PostgreSQL holds.
CREATE OR REPLACE FUNCTION fleet.load(line text, source text, bytes text DEFAULT NULL) RETURNS void
LANGUAGE plpgsql SECURITY DEFINER SET search_path = pg_catalog AS $$
DECLARE
    document jsonb;
BEGIN
    IF bytes::integer <> octet_length(line) THEN
        RAISE invalid_parameter_value USING MESSAGE = format('the line held %s bytes NUL', bytes::integer - octet_length(line));
    END IF;
    document := fleet.parse(line, source);
    PERFORM fleet.check_record(document);
    PERFORM fleet.take(document, source);
EXCEPTION WHEN OTHERS THEN
    -- data, a constraint, a feature, a limit of the program; see PostgreSQL's list of error codes
    IF left(SQLSTATE, 2) NOT IN ('22', '23', '0A', '54') THEN
        RAISE;
    END IF;
    INSERT INTO fleet.rejects (verdict, source, code, reason, line) VALUES ('refused', source, SQLSTATE, SQLERRM, line);
END $$;

-- Deletes what is older: versions of instances that are no longer present, runs but each host's last, rejects, and
-- records whose end never arrived, which leave a line in the rejects first.
CREATE OR REPLACE FUNCTION fleet.expire(age interval) RETURNS void LANGUAGE sql SET search_path = pg_catalog AS $$
    DELETE FROM fleet.instances WHERE until < now() - age;
    DELETE FROM fleet.runs AS r USING fleet.hosts AS h
        WHERE h.host = r.host AND r.at < now() - age AND r.at < h.last_seen AND r.at IS DISTINCT FROM h.last_complete;
    DELETE FROM fleet.rejects WHERE at < now() - age;
    WITH gone AS (DELETE FROM fleet.inbox WHERE arrived < now() - age RETURNING host, run, source)
        INSERT INTO fleet.rejects (verdict, source, reason, line)
        SELECT 'expired', min(source), format('%s records of host %s, run %s without its end', count(*), host, run), ''
        FROM gone GROUP BY host, run;
$$;

-- Deletes everything that is known of a host, rejects apart.
CREATE OR REPLACE FUNCTION fleet.forget(of_host text) RETURNS void LANGUAGE sql SET search_path = pg_catalog AS $$
    DELETE FROM fleet.instances WHERE host = of_host;
    DELETE FROM fleet.runs WHERE host = of_host;
    DELETE FROM fleet.inbox WHERE host = of_host;
    DELETE FROM fleet.hosts WHERE host = of_host;
$$;

REVOKE ALL ON ALL FUNCTIONS IN SCHEMA fleet FROM PUBLIC;
GRANT EXECUTE ON FUNCTION fleet.load(text, text, text) TO fleet_load;
