-- Prepares a database for projects that a team shares. Run it once, as the role that will own the projects:
--
--     psql --set ON_ERROR_STOP=1 --single-transaction --file setup.sql "service=SERVICE"
--
-- The role needs CREATE on the database and CREATEROLE. It alone deletes entries, and row-level security does not apply
-- to it: give it to administrators only. Everybody else gets a role of one project, see the table pm.project.
--
-- The script contains plain statements only, without extensions. A second run fails and changes nothing.

CREATE SCHEMA pm;

-- The rights on the tables. A role of a project is a member of one of these two, and gets the tables from it and the rows
-- from the policies below. Roles belong to the whole server, so another database may have created them already.
DO $$
BEGIN
    IF NOT EXISTS (SELECT FROM pg_roles WHERE rolname = 'pm_reader') THEN
        CREATE ROLE pm_reader NOLOGIN;
    END IF;
    IF NOT EXISTS (SELECT FROM pg_roles WHERE rolname = 'pm_writer') THEN
        CREATE ROLE pm_writer NOLOGIN IN ROLE pm_reader;
    END IF;
END $$;

-- One row for each project. Members of the two roles read it, or write it. The format is that of the entries: clients
-- refuse a later one than they know.
CREATE TABLE pm.project (
    project uuid PRIMARY KEY,
    name    text NOT NULL,
    format  int  NOT NULL DEFAULT 1,
    reader  name NOT NULL,
    writer  name NOT NULL
);

-- The log of each project: bodies (kind b) and batches (kind t), numbered without gaps. There are no foreign keys: the
-- policies require the project, and a key would cost each append a lock on the project's row.
CREATE TABLE pm.entry (
    project uuid        NOT NULL,
    version bigint      NOT NULL CHECK (version > 0),
    id      uuid        NOT NULL,
    kind    char(1)     NOT NULL CHECK (kind IN ('b', 't')),
    after   bytea       NOT NULL CHECK (octet_length(after) <= 64),
    sum     bytea       NOT NULL CHECK (octet_length(sum) <= 64),
    lines   bytea       NOT NULL CHECK (octet_length(lines) <= 1048576),
    pieces  int         NOT NULL CHECK (CASE WHEN kind = 'b' THEN pieces > 0 ELSE pieces = 0 END),
    author  name        NOT NULL DEFAULT session_user,
    host    text        NOT NULL CHECK (octet_length(host) <= 255),
    at      timestamptz NOT NULL DEFAULT now(),
    PRIMARY KEY (project, version)
);

-- The pieces of bodies, compressed, numbered from 1. They are committed together with their entry.
CREATE TABLE pm.piece (
    project uuid  NOT NULL,
    id      uuid  NOT NULL,
    number  int   NOT NULL CHECK (number > 0),
    bytes   bytea NOT NULL CHECK (octet_length(bytes) <= 1048576),
    PRIMARY KEY (project, id, number)
);
-- The bytes are compressed already.
ALTER TABLE pm.piece ALTER COLUMN bytes SET STORAGE EXTERNAL;

-- A writer that finds its entry after a lost connection writes here before it reports the entry as stored: the commit
-- waits for a synchronous standby, and so for the entry, too.
CREATE TABLE pm.barrier (
    project uuid   PRIMARY KEY,
    n       bigint NOT NULL DEFAULT 0
);

-- Rights. The author and the time of an entry are not in the list of columns: nobody can set them.
GRANT USAGE ON SCHEMA pm TO pm_reader;
GRANT SELECT ON pm.project, pm.entry, pm.piece, pm.barrier TO pm_reader;
GRANT INSERT (project, version, id, kind, after, sum, lines, pieces, host) ON pm.entry TO pm_writer;
GRANT INSERT (project, id, number, bytes) ON pm.piece TO pm_writer;
GRANT UPDATE (n) ON pm.barrier TO pm_writer;

-- Rows. A project is visible to the members of its roles, and everything else is visible with its project. If a role was
-- dropped, to_regrole returns null, and nobody is a member; with the name, each query of each user would fail.
ALTER TABLE pm.project ENABLE ROW LEVEL SECURITY;
ALTER TABLE pm.entry ENABLE ROW LEVEL SECURITY;
ALTER TABLE pm.piece ENABLE ROW LEVEL SECURITY;
ALTER TABLE pm.barrier ENABLE ROW LEVEL SECURITY;

CREATE POLICY read ON pm.project FOR SELECT
    USING (pg_has_role(to_regrole(quote_ident(reader))::oid, 'USAGE')
           OR pg_has_role(to_regrole(quote_ident(writer))::oid, 'USAGE'));

CREATE POLICY read ON pm.entry FOR SELECT
    USING (EXISTS (SELECT FROM pm.project p WHERE p.project = entry.project));
CREATE POLICY write ON pm.entry FOR INSERT
    WITH CHECK (author = session_user
                AND EXISTS (SELECT FROM pm.project p WHERE p.project = entry.project
                            AND pg_has_role(to_regrole(quote_ident(p.writer))::oid, 'USAGE')));

CREATE POLICY read ON pm.piece FOR SELECT
    USING (EXISTS (SELECT FROM pm.project p WHERE p.project = piece.project));
CREATE POLICY write ON pm.piece FOR INSERT
    WITH CHECK (EXISTS (SELECT FROM pm.project p WHERE p.project = piece.project
                        AND pg_has_role(to_regrole(quote_ident(p.writer))::oid, 'USAGE')));

CREATE POLICY read ON pm.barrier FOR SELECT
    USING (EXISTS (SELECT FROM pm.project p WHERE p.project = barrier.project));
CREATE POLICY write ON pm.barrier FOR UPDATE
    USING (EXISTS (SELECT FROM pm.project p WHERE p.project = barrier.project
                        AND pg_has_role(to_regrole(quote_ident(p.writer))::oid, 'USAGE')));
