-- SPDX-License-Identifier: MIT
-- What a fleet is asked. A host's partial run never makes anything appear removed or lacking: such answers rest on its
-- last complete run, and say when that was.

-- Which hosts lack an instance of the class with these properties? Named exactly, classes below it do not count.
--   SELECT * FROM fleet.lacking('LNX_BlockDevice');
--   SELECT * FROM fleet.lacking('LNX_OperatingSystem', '{"Version": "6.1.0-26"}');
-- as_of: the complete run that lacked it; null when the host never had a complete run, so that nothing is known.
-- is_current: that run is the host's last one.
CREATE OR REPLACE FUNCTION fleet.lacking(of_class text, having_properties jsonb DEFAULT '{}')
RETURNS TABLE (host text, name text, as_of timestamptz, is_current boolean) LANGUAGE sql STABLE AS $$
    SELECT h.host, h.name, h.last_complete, h.last_state = 'complete'
    FROM fleet.hosts AS h
    WHERE NOT EXISTS (SELECT FROM fleet.instances AS i WHERE i.host = h.host AND i.class = of_class AND i.until IS NULL
                      AND i.properties @> having_properties)
    ORDER BY h.name, h.host;
$$;

-- What changed in a time? A host that was first seen in it is one row, "new host", without its instances.
--   SELECT * FROM fleet.changes(now() - interval '1 day');
--   SELECT change, class, count(*) FROM fleet.changes(now() - interval '1 day') GROUP BY 1, 2;
-- names: of the properties that differ. A thing that changed twice is two rows.
CREATE OR REPLACE FUNCTION fleet.changes(from_time timestamptz, to_time timestamptz DEFAULT 'infinity')
RETURNS TABLE (at timestamptz, host text, host_name text, change text, class text, path text, names text[], before jsonb,
               after jsonb) LANGUAGE sql STABLE AS $$
    WITH opened AS (SELECT * FROM fleet.instances WHERE since >= from_time AND since < to_time),
         closed AS (SELECT * FROM fleet.instances WHERE until >= from_time AND until < to_time),
         steps AS (
             SELECT coalesce(o.since, c.until) AS at, coalesce(o.host, c.host) AS host,
                    CASE WHEN c.host IS NULL THEN 'added' WHEN o.host IS NULL THEN 'removed' ELSE 'changed' END AS change,
                    coalesce(o.class, c.class) AS class, coalesce(o.path, c.path) AS path,
                    c.properties AS before, o.properties AS after
             FROM opened AS o FULL JOIN closed AS c ON c.host = o.host AND c.ident = o.ident AND c.until = o.since)
    SELECT s.at, s.host, h.name, s.change, s.class, s.path,
           CASE s.change WHEN 'changed' THEN ARRAY(
               SELECT key FROM jsonb_object_keys(s.before || s.after) AS key
               WHERE s.before -> key IS DISTINCT FROM s.after -> key ORDER BY key) END,
           s.before, s.after
    FROM steps AS s JOIN fleet.hosts AS h USING (host)
    WHERE h.first_seen < from_time
    UNION ALL
    SELECT first_seen, host, name, 'new host', NULL, NULL, NULL, NULL, NULL FROM fleet.hosts
    WHERE first_seen >= from_time AND first_seen < to_time
    ORDER BY 1, 2, 5, 6;
$$;

-- Which vendor went missing where? A provider that had instances in an earlier run of the host and has none in its last.
--   SELECT provider, verdict, count(*) FROM fleet.missing_vendors() GROUP BY 1, 2;
-- verdict: "lost" when the last run is partial, so that the vendor may be back tomorrow and its instances still count
-- as present; "removed" when the last run is complete. reasons: what the run says it lost, of this vendor or at large.
CREATE OR REPLACE FUNCTION fleet.missing_vendors(within interval DEFAULT '90 days')
RETURNS TABLE (host text, name text, provider text, verdict text, last_had_it timestamptz, missing_in timestamptz,
               reasons text[]) LANGUAGE sql STABLE AS $$
    WITH had AS (
        SELECT r.host, each.key AS provider, max(r.at) AS at
        FROM fleet.runs AS r, jsonb_each_text(r.instances) AS each
        WHERE r.state <> 'late' AND each.value::integer > 0 AND r.at > now() - within
        GROUP BY r.host, each.key)
    SELECT h.host, h.name, had.provider, CASE h.last_state WHEN 'complete' THEN 'removed' ELSE 'lost' END, had.at, h.last_seen,
           ARRAY(SELECT loss ->> 'text' FROM fleet.runs AS r, jsonb_array_elements(r.losses) AS loss
                 WHERE r.host = h.host AND r.at = h.last_seen
                 AND coalesce(loss ->> 'vendor', had.provider) = had.provider)
    FROM fleet.hosts AS h JOIN had ON had.host = h.host AND had.at < h.last_seen
    ORDER BY had.provider, h.name, h.host;
$$;

-- Hosts that have sent nothing for two days, runs whose end has not arrived for an hour, and what each host lost last.
CREATE OR REPLACE VIEW fleet.silent_hosts AS
    SELECT host, name, last_seen FROM fleet.hosts WHERE last_seen < now() - interval '2 days';
CREATE OR REPLACE VIEW fleet.unfinished_runs AS
    SELECT host, run, count(*) AS records, min(arrived) AS first_arrived, min(source) AS source
    FROM fleet.inbox AS i WHERE NOT EXISTS (SELECT FROM fleet.runs AS r WHERE r.host = i.host AND r.run = i.run)
    GROUP BY host, run HAVING max(arrived) < now() - interval '1 hour';
CREATE OR REPLACE VIEW fleet.last_losses AS
    SELECT h.host, h.name, r.at, r.expected - r.arrived AS missing_records, loss ->> 'vendor' AS vendor, loss ->> 'text' AS text
    FROM fleet.hosts AS h JOIN fleet.runs AS r ON r.host = h.host AND r.at = h.last_seen
    LEFT JOIN jsonb_array_elements(r.losses) AS loss ON true
    WHERE r.state = 'partial';

REVOKE ALL ON FUNCTION fleet.lacking, fleet.changes, fleet.missing_vendors FROM PUBLIC;
GRANT EXECUTE ON FUNCTION fleet.lacking, fleet.changes, fleet.missing_vendors TO fleet_read;
GRANT SELECT ON fleet.silent_hosts, fleet.unfinished_runs, fleet.last_losses TO fleet_read;
