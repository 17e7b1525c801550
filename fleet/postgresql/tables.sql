-- SPDX-License-Identifier: MIT
-- The tables of a fleet's inventory. Once, in a database with the encoding UTF8, as its owner:
--   psql -v ON_ERROR_STOP=1 -1 -f tables.sql -f load.sql -f questions.sql fleet
-- load.sql and questions.sql hold functions and views only; they may be run again after an upgrade.
CREATE SCHEMA fleet;

CREATE TABLE fleet.hosts (
    host          text PRIMARY KEY,     -- the machine id, or the name of a machine without one
    name          text,
    product       text,
    serial        text,
    first_seen    timestamptz NOT NULL, -- times are those of runs, by the host's clock, never later than their arrival
    last_seen     timestamptz NOT NULL, -- the latest run, whole or partial
    last_state    text NOT NULL,        -- that run's state
    last_complete timestamptz           -- the latest complete run; null when there has been none
);

CREATE TABLE fleet.runs (
    host       text NOT NULL,
    run        text NOT NULL,
    at         timestamptz NOT NULL,
    -- complete: all records are here and the host lost nothing. partial: it lost something, or records are missing here.
    -- late: a newer run of the host was here first; kept for the record, and not applied.
    state      text NOT NULL CHECK (state IN ('complete', 'partial', 'late')),
    is_whole   boolean NOT NULL,        -- as many records arrived as the end record counts
    expected   integer NOT NULL,        -- records of classes and instances, by the end record
    arrived    integer NOT NULL,
    instances  jsonb NOT NULL,          -- {"provider": number of instances}, 0 for a provider that has classes alone
    losses     jsonb NOT NULL,
    notes      jsonb NOT NULL,
    loaded_at  timestamptz NOT NULL DEFAULT now(),
    PRIMARY KEY (host, run)
);
CREATE INDEX ON fleet.runs (host, at);

-- One row for each declaration of a class that any host has delivered; hosts with the same vendor's version share it.
CREATE TABLE fleet.classes (
    class_id   integer GENERATED ALWAYS AS IDENTITY PRIMARY KEY,
    provider   text NOT NULL,
    class      text NOT NULL,
    superclass text,
    properties jsonb NOT NULL,          -- the declarations: type, units, value map, texts
    volatile   text[] NOT NULL,         -- names of properties that differ between two runs of an unchanged machine
    digest     uuid NOT NULL UNIQUE     -- of all the above
);
CREATE INDEX ON fleet.classes (provider, class);

-- One row for each version of an instance: from the run that first had it so to the run that had it no longer so.
CREATE TABLE fleet.instances (
    host       text NOT NULL,
    ident      uuid NOT NULL,           -- of provider, class and path, which may be longer than an index entry
    class_id   integer NOT NULL REFERENCES fleet.classes,
    provider   text NOT NULL,
    class      text NOT NULL,
    path       text NOT NULL,
    key        jsonb NOT NULL,
    properties jsonb NOT NULL,          -- without the volatile ones
    volatile   jsonb NOT NULL,          -- those, as the last run that had this version delivered them
    name       text GENERATED ALWAYS AS (left(properties ->> 'Name', 200)) STORED,
    serial     text GENERATED ALWAYS AS (left(properties ->> 'SerialNumber', 200)) STORED,
    version    text GENERATED ALWAYS AS (left(properties ->> 'Version', 200)) STORED,
    since      timestamptz NOT NULL,
    until      timestamptz              -- null: present
) WITH (fillfactor = 80, autovacuum_vacuum_scale_factor = 0.05); -- volatile values are updated in place
CREATE UNIQUE INDEX instances_present ON fleet.instances (host, ident) WHERE until IS NULL;
CREATE INDEX instances_class ON fleet.instances (class, host) WHERE until IS NULL;
CREATE INDEX instances_since ON fleet.instances (since);
CREATE INDEX instances_until ON fleet.instances (until) WHERE until IS NOT NULL;
CREATE INDEX instances_class_id ON fleet.instances (class_id);

-- Records of runs whose end has not arrived.
CREATE TABLE fleet.inbox (
    host    text NOT NULL,
    run     text NOT NULL,
    seq     integer NOT NULL,
    record  jsonb NOT NULL,
    source  text,
    arrived timestamptz NOT NULL DEFAULT now(),
    PRIMARY KEY (host, run, seq)
) WITH (autovacuum_vacuum_scale_factor = 0.02);
ALTER TABLE fleet.inbox ALTER COLUMN record SET COMPRESSION lz4;

-- Every line that did not become a record as it is.
CREATE TABLE fleet.rejects (
    id      bigint GENERATED ALWAYS AS IDENTITY PRIMARY KEY,
    at      timestamptz NOT NULL DEFAULT now(),
    -- refused: not loaded, its run cannot become complete. altered: loaded, with U+FFFD in the place of what jsonb
    -- cannot hold. duplicate: the run has another instance with this path, which was loaded. expired: its run's end
    -- never arrived.
    verdict text NOT NULL CHECK (verdict IN ('refused', 'altered', 'duplicate', 'expired')),
    source  text,                       -- the file that it came from
    code    text,                       -- SQLSTATE
    reason  text NOT NULL,
    line    text NOT NULL
);
CREATE INDEX ON fleet.rejects (at);

-- Shippers may call the one function that loads a line; who asks may read everything but the rejects' text.
DO $$
BEGIN
    IF NOT EXISTS (SELECT FROM pg_roles WHERE rolname = 'fleet_load') THEN
        CREATE ROLE fleet_load NOLOGIN;
    END IF;
    IF NOT EXISTS (SELECT FROM pg_roles WHERE rolname = 'fleet_read') THEN
        CREATE ROLE fleet_read NOLOGIN;
    END IF;
END $$;
GRANT USAGE ON SCHEMA fleet TO fleet_load, fleet_read;
GRANT SELECT ON fleet.hosts, fleet.runs, fleet.classes, fleet.instances TO fleet_read;
GRANT SELECT (id, at, verdict, source, code, reason) ON fleet.rejects TO fleet_read;
