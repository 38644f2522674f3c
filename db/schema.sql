-- QUARVO database schema: every persistent table of the project side (base VOVOVA),
-- the purchasing side (base GESCOM), the runtime ($$) and the sibling-module stand-ins.
-- One database file holds all bases, so one transaction covers pieces, links and budget lines.
--
-- Run as one script (sqlite3_exec). Every statement is idempotent: running the script
-- again on an existing database changes nothing.
--
-- Declared column types tell the runtime how to convert a stored value:
--   TEXT               plain text
--   INTEGER            whole number
--   REAL               quantity, hours, rate, percentage
--   DECIMAL_TEXT       exact amount as canonical decimal text ('1234.50', '-12.00')
--   DATE_TEXT          ISO date '2026-12-31'; NULL or '' means no date
--   TIME_TEXT          time of day '14:05:00'
--   DECIMAL_LIST_TEXT  several exact amounts joined by ';' ('10.00;10.00;10.00')
--   DATE_LIST_TEXT     several ISO dates joined by ';'
-- All of them get TEXT affinity from SQLite except INTEGER and REAL.
--
-- Identifiers ("IDENT") are 10-digit zero-padded texts ('0000000042'), so text order is
-- numeric order. A line's "NUMERO" is its header's IDENT, '|', then the line number.
-- Only primary keys are NOT NULL; every other column is nullable or has a default, so a
-- program may insert a row naming only the columns it knows.
-- No foreign keys are declared: pieces, projects and budgets are deleted by their own
-- modules, which purge what refers to them (links, movements, time pointing).

------------------------------------------------------------------------------------------
-- Meta
------------------------------------------------------------------------------------------

-- Identity and version of this database layout (owner: QUARVO).
CREATE TABLE IF NOT EXISTS "QUARVO_META" (
    "CLE"    TEXT NOT NULL PRIMARY KEY,
    "VALEUR" TEXT
);
INSERT OR IGNORE INTO "QUARVO_META" ("CLE", "VALEUR") VALUES ('application', 'QUARVO');
INSERT OR IGNORE INTO "QUARVO_META" ("CLE", "VALEUR") VALUES ('schema_version', '1');

------------------------------------------------------------------------------------------
-- Link table (base VOVOVA, owner: QUARVO)
------------------------------------------------------------------------------------------

-- One row links one purchasing piece (order, goods-received note, invoice) or one time
-- entry to one budget line, with the quantity and amount of the piece that belong to it.
-- "CLE_COMPO"  = budget line IDENT | component | piece number   (is this piece on this line?)
-- "CLE_COMPO2" = component | component IDENT |                  (every link of one piece)
-- Both keys are derived from the other columns by the triggers below, so every writer
-- (link document, imputation, import, cancellation) finds rows by them without building them.
CREATE TABLE IF NOT EXISTS "QUARVO" (
    "IDENT"           TEXT NOT NULL PRIMARY KEY,
    "AFEBUD_IDENT"    TEXT,
    "AFAFFA_IDENT"    TEXT,
    "AFAFFA_CODE"     TEXT,
    "AFLBUD_IDENT"    TEXT,
    "COMPOSANT"       TEXT,                         -- GAPECOM, GAPEBL, GAPEFAC or AFEFFO
    "COMPOSANT_IDENT" TEXT,
    "PIECE"           TEXT,                         -- document number of the piece
    "DATE_PIECE"      DATE_TEXT,
    "QTE"             REAL DEFAULT 0,               -- quantity attached to the budget line
    "QTT"             REAL DEFAULT 0,               -- share of QTE carried further down the chain
    "HT"              DECIMAL_TEXT DEFAULT '0.00',  -- amount excluding tax attached
    "DATE_MAJ"        DATE_TEXT,                    -- last change of the piece when linked
    "HEURE_MAJ"       TIME_TEXT,
    "CLE_COMPO"       TEXT,
    "CLE_COMPO2"      TEXT
);
CREATE INDEX IF NOT EXISTS "IX_QUARVO_AFLBUD_IDENT" ON "QUARVO" ("AFLBUD_IDENT");
CREATE INDEX IF NOT EXISTS "IX_QUARVO_CLE_COMPO" ON "QUARVO" ("CLE_COMPO");
CREATE INDEX IF NOT EXISTS "IX_QUARVO_CLE_COMPO2" ON "QUARVO" ("CLE_COMPO2");
CREATE INDEX IF NOT EXISTS "IX_QUARVO_COMPOSANT" ON "QUARVO" ("COMPOSANT", "COMPOSANT_IDENT");
CREATE INDEX IF NOT EXISTS "IX_QUARVO_AFAFFA_IDENT" ON "QUARVO" ("AFAFFA_IDENT");
CREATE INDEX IF NOT EXISTS "IX_QUARVO_AFEBUD_IDENT" ON "QUARVO" ("AFEBUD_IDENT");

CREATE TRIGGER IF NOT EXISTS "TR_QUARVO_CLES_INS" AFTER INSERT ON "QUARVO"
BEGIN
    UPDATE "QUARVO"
       SET "CLE_COMPO"  = coalesce(NEW."AFLBUD_IDENT", '') || '|' || coalesce(NEW."COMPOSANT", '')
                          || '|' || coalesce(NEW."PIECE", ''),
           "CLE_COMPO2" = coalesce(NEW."COMPOSANT", '') || '|' || coalesce(NEW."COMPOSANT_IDENT", '') || '|'
     WHERE rowid = NEW.rowid;
END;

CREATE TRIGGER IF NOT EXISTS "TR_QUARVO_CLES_UPD"
AFTER UPDATE OF "AFLBUD_IDENT", "COMPOSANT", "COMPOSANT_IDENT", "PIECE" ON "QUARVO"
BEGIN
    UPDATE "QUARVO"
       SET "CLE_COMPO"  = coalesce(NEW."AFLBUD_IDENT", '') || '|' || coalesce(NEW."COMPOSANT", '')
                          || '|' || coalesce(NEW."PIECE", ''),
           "CLE_COMPO2" = coalesce(NEW."COMPOSANT", '') || '|' || coalesce(NEW."COMPOSANT_IDENT", '') || '|'
     WHERE rowid = NEW.rowid;
END;

------------------------------------------------------------------------------------------
-- Project side (base VOVOVA)
------------------------------------------------------------------------------------------

-- Companies and their parameters (owner: AFSOCI). Read by code, the current company being
-- "SOCIETE". "MOIS_ANNEE" is the current period as month then year, 'mmyyyy'.
-- "DATE_DEBUT"/"DATE_FIN" list the fiscal years, index 0 being the current one.
-- "LIAISON_C" = 'O': integrated accounting link; "LIAISON_G" = 'O': purchasing link
-- (orders and goods-received notes are linked too); "OPTION8" = 'O': pieces may be linked
-- before they are validated; "OPTION9" = 'O': goods received and not yet invoiced count
-- as realised.
CREATE TABLE IF NOT EXISTS "AFSOCI" (
    "IDENT"      TEXT NOT NULL PRIMARY KEY,
    "CODE"       TEXT,
    "DESIG"      TEXT,
    "LIAISON_C"  TEXT DEFAULT 'N',
    "LIAISON_G"  TEXT DEFAULT 'N',
    "OPTION8"    TEXT DEFAULT 'N',
    "OPTION9"    TEXT DEFAULT 'N',
    "MOIS_ANNEE" TEXT,
    "DATE_DEBUT" DATE_LIST_TEXT,
    "DATE_FIN"   DATE_LIST_TEXT
);
CREATE UNIQUE INDEX IF NOT EXISTS "UX_AFSOCI_CODE" ON "AFSOCI" ("CODE");

-- Project-module parameters by code (owner: AFPARA): "MACHAT" (purchase grouping:
-- "PARAM1" criterion 0..3, used when "PARAM3" = '1'), "IMPORT_03".."IMPORT_06" (import of
-- quotes, orders, receipts, invoices: "PARAM1" 'O' allowed, "PARAM2" default file path).
CREATE TABLE IF NOT EXISTS "AFPARA" (
    "CODE"   TEXT NOT NULL PRIMARY KEY,
    "DESIG"  TEXT,
    "PARAM1" TEXT,
    "PARAM2" TEXT,
    "PARAM3" TEXT
);

-- Purchase grouping rule behind AFPARA "REGROUPEMENT_ACHAT" (owner: AFPARA): which service
-- (AFPRES) the purchases of an item belong to. "CRITERE" 0 keys on the item itself
-- ("CLE_IDENT" = GCPARTIC IDENT), 1..3 on the item's purchasing criterion 1..3
-- ("CLE_IDENT" = GCPCRIT1/2/3 IDENT).
CREATE TABLE IF NOT EXISTS "AFREGACH" (
    "IDENT"        TEXT NOT NULL PRIMARY KEY,
    "CRITERE"      INTEGER DEFAULT 0,
    "CLE_IDENT"    TEXT,
    "AFPRES_IDENT" TEXT
);
CREATE INDEX IF NOT EXISTS "IX_AFREGACH_CLE" ON "AFREGACH" ("CRITERE", "CLE_IDENT");

-- Customers (owner: AFCLIE).
CREATE TABLE IF NOT EXISTS "AFCLIE" (
    "IDENT" TEXT NOT NULL PRIMARY KEY,
    "CODE"  TEXT,
    "DESIG" TEXT
);
CREATE UNIQUE INDEX IF NOT EXISTS "UX_AFCLIE_CODE" ON "AFCLIE" ("CODE");

-- Establishments of the company (owner: AFETAB).
CREATE TABLE IF NOT EXISTS "AFETAB" (
    "IDENT" TEXT NOT NULL PRIMARY KEY,
    "CODE"  TEXT,
    "DESIG" TEXT
);
CREATE UNIQUE INDEX IF NOT EXISTS "UX_AFETAB_CODE" ON "AFETAB" ("CODE");

-- Departments (owner: AFSERV).
CREATE TABLE IF NOT EXISTS "AFSERV" (
    "IDENT" TEXT NOT NULL PRIMARY KEY,
    "CODE"  TEXT,
    "DESIG" TEXT
);
CREATE UNIQUE INDEX IF NOT EXISTS "UX_AFSERV_CODE" ON "AFSERV" ("CODE");

-- First and second person in charge of a project (owners: AFRPS1, AFRPS2); grouping
-- criteria of the follow-up report.
CREATE TABLE IF NOT EXISTS "AFRPS1" (
    "IDENT"  TEXT NOT NULL PRIMARY KEY,
    "CODE"   TEXT,
    "NOM"    TEXT,
    "PRENOM" TEXT
);
CREATE UNIQUE INDEX IF NOT EXISTS "UX_AFRPS1_CODE" ON "AFRPS1" ("CODE");

CREATE TABLE IF NOT EXISTS "AFRPS2" (
    "IDENT"  TEXT NOT NULL PRIMARY KEY,
    "CODE"   TEXT,
    "NOM"    TEXT,
    "PRENOM" TEXT
);
CREATE UNIQUE INDEX IF NOT EXISTS "UX_AFRPS2_CODE" ON "AFRPS2" ("CODE");

-- Free project criteria 1 to 5 (owners: AFCRI1..AFCRI5); grouping criteria of the report.
CREATE TABLE IF NOT EXISTS "AFCRI1" ("IDENT" TEXT NOT NULL PRIMARY KEY, "CODE" TEXT, "DESIG" TEXT);
CREATE TABLE IF NOT EXISTS "AFCRI2" ("IDENT" TEXT NOT NULL PRIMARY KEY, "CODE" TEXT, "DESIG" TEXT);
CREATE TABLE IF NOT EXISTS "AFCRI3" ("IDENT" TEXT NOT NULL PRIMARY KEY, "CODE" TEXT, "DESIG" TEXT);
CREATE TABLE IF NOT EXISTS "AFCRI4" ("IDENT" TEXT NOT NULL PRIMARY KEY, "CODE" TEXT, "DESIG" TEXT);
CREATE TABLE IF NOT EXISTS "AFCRI5" ("IDENT" TEXT NOT NULL PRIMARY KEY, "CODE" TEXT, "DESIG" TEXT);
CREATE UNIQUE INDEX IF NOT EXISTS "UX_AFCRI1_CODE" ON "AFCRI1" ("CODE");
CREATE UNIQUE INDEX IF NOT EXISTS "UX_AFCRI2_CODE" ON "AFCRI2" ("CODE");
CREATE UNIQUE INDEX IF NOT EXISTS "UX_AFCRI3_CODE" ON "AFCRI3" ("CODE");
CREATE UNIQUE INDEX IF NOT EXISTS "UX_AFCRI4_CODE" ON "AFCRI4" ("CODE");
CREATE UNIQUE INDEX IF NOT EXISTS "UX_AFCRI5_CODE" ON "AFCRI5" ("CODE");

-- Projects (owner: AFAFFA). The project code is also the analytical section code
-- ("SECAN_CODE") quoted on purchasing pieces. Each grouping family has its code and IDENT.
-- A project with a "DATE_CLOTURE" is closed: its section accepts no more pieces.
CREATE TABLE IF NOT EXISTS "AFAFFA" (
    "IDENT"         TEXT NOT NULL PRIMARY KEY,
    "CODE"          TEXT,
    "DESIG"         TEXT,
    "DATE_CREATION" DATE_TEXT,
    "DATE_DEBUT"    DATE_TEXT,
    "DATE_FIN"      DATE_TEXT,
    "DATE_CLOTURE"  DATE_TEXT,
    "AFCLIE_IDENT"  TEXT,
    "AFCLIE_CODE"   TEXT,
    "AFETAB_IDENT"  TEXT,
    "AFETAB_CODE"   TEXT,
    "AFSERV_IDENT"  TEXT,
    "AFSERV_CODE"   TEXT,
    "AFRPS1_IDENT"  TEXT,
    "AFRPS1_CODE"   TEXT,
    "AFRPS2_IDENT"  TEXT,
    "AFRPS2_CODE"   TEXT,
    "AFCRI1_IDENT"  TEXT,
    "AFCRI1_CODE"   TEXT,
    "AFCRI2_IDENT"  TEXT,
    "AFCRI2_CODE"   TEXT,
    "AFCRI3_IDENT"  TEXT,
    "AFCRI3_CODE"   TEXT,
    "AFCRI4_IDENT"  TEXT,
    "AFCRI4_CODE"   TEXT,
    "AFCRI5_IDENT"  TEXT,
    "AFCRI5_CODE"   TEXT
);
CREATE UNIQUE INDEX IF NOT EXISTS "UX_AFAFFA_CODE" ON "AFAFFA" ("CODE");
CREATE INDEX IF NOT EXISTS "IX_AFAFFA_DATE_CREATION" ON "AFAFFA" ("DATE_CREATION");

-- Users' visibility of projects (owner: AFDROI). A user without any row sees every
-- project; with rows, only the projects of the listed establishments and departments
-- (an empty code stands for all).
CREATE TABLE IF NOT EXISTS "AFDROI" (
    "IDENT"       TEXT NOT NULL PRIMARY KEY,
    "UTILISATEUR" TEXT,
    "AFETAB_CODE" TEXT,
    "AFSERV_CODE" TEXT
);
CREATE INDEX IF NOT EXISTS "IX_AFDROI_UTILISATEUR" ON "AFDROI" ("UTILISATEUR");

-- Purchase posts of the results (owner: AFRESU): the "POSTE_ACHAT" of a service and the
-- "CPOST" of an account name one of them.
CREATE TABLE IF NOT EXISTS "AFPOST" (
    "IDENT" TEXT NOT NULL PRIMARY KEY,
    "CODE"  TEXT,
    "DESIG" TEXT
);
CREATE UNIQUE INDEX IF NOT EXISTS "UX_AFPOST_CODE" ON "AFPOST" ("CODE");

-- Services that budget lines budget (owner: AFPRES). "NATURE" 'P' is a personnel service
-- (time pointing applies); "POSTE_ACHAT" is the purchase post its purchases go to.
CREATE TABLE IF NOT EXISTS "AFPRES" (
    "IDENT"       TEXT NOT NULL PRIMARY KEY,
    "CODE"        TEXT,
    "DESIG"       TEXT,
    "NATURE"      TEXT,
    "POSTE_ACHAT" TEXT,
    "UNITE"       TEXT
);
CREATE UNIQUE INDEX IF NOT EXISTS "UX_AFPRES_CODE" ON "AFPRES" ("CODE");

-- Project budget headers (owner: AFEBUD). "PIECE" is the budget number ('MANUEL' for a
-- budget entered by hand); "ORIGINE" 'GCPEDEV' or 'GCPECOM' when built from a customer
-- quote or order. "CODE_ETAT": A anticipated, E in progress, P partly invoiced, T fully
-- invoiced, C closed. "CLE_COMPO2" = project code | budget number (filled by trigger),
-- the key by which imported pieces name their budget.
CREATE TABLE IF NOT EXISTS "AFEBUD" (
    "IDENT"         TEXT NOT NULL PRIMARY KEY,
    "AFAFFA_IDENT"  TEXT,
    "AFAFFA_CODE"   TEXT,
    "PIECE"         TEXT,
    "ORIGINE"       TEXT,
    "DESIG"         TEXT,
    "TYPE"          TEXT,
    "CODE_ETAT"     TEXT,
    "VBUD_INI"      DECIMAL_TEXT DEFAULT '0.00',
    "VBUD_REV"      DECIMAL_TEXT DEFAULT '0.00',
    "DATE_CREATION" DATE_TEXT,
    "DATE_DEBUT"    DATE_TEXT,
    "DATE_FIN"      DATE_TEXT,
    "DATE_CLOTURE"  DATE_TEXT,
    "CLE_COMPO2"    TEXT
);
CREATE INDEX IF NOT EXISTS "IX_AFEBUD_AFAFFA_IDENT" ON "AFEBUD" ("AFAFFA_IDENT");
CREATE INDEX IF NOT EXISTS "IX_AFEBUD_CLE_COMPO2" ON "AFEBUD" ("CLE_COMPO2");
CREATE INDEX IF NOT EXISTS "IX_AFEBUD_DATE_CREATION" ON "AFEBUD" ("DATE_CREATION");

CREATE TRIGGER IF NOT EXISTS "TR_AFEBUD_CLE_INS" AFTER INSERT ON "AFEBUD"
BEGIN
    UPDATE "AFEBUD"
       SET "CLE_COMPO2" = coalesce(NEW."AFAFFA_CODE", '') || '|' || coalesce(NEW."PIECE", '')
     WHERE rowid = NEW.rowid;
END;

CREATE TRIGGER IF NOT EXISTS "TR_AFEBUD_CLE_UPD" AFTER UPDATE OF "AFAFFA_CODE", "PIECE" ON "AFEBUD"
BEGIN
    UPDATE "AFEBUD"
       SET "CLE_COMPO2" = coalesce(NEW."AFAFFA_CODE", '') || '|' || coalesce(NEW."PIECE", '')
     WHERE rowid = NEW.rowid;
END;

-- Budget lines (owner: AFLBUD). "NUMERO" = budget IDENT | line number (a line created by
-- imputation or import may carry the budget IDENT and '|' only). "STYLE" 0 is a service
-- line, any other value a title or comment line. Follow-up figures kept from the links:
-- "VENG" committed by orders, "VREA" realised and "VRAF" remaining, each three values
-- (indexes 0, 1, 2); "AFFECTE" 'O' freezes the remaining figures; "AVT" progress in %.
-- "AFEBUD_IDENT" is filled from "NUMERO" when not given.
CREATE TABLE IF NOT EXISTS "AFLBUD" (
    "IDENT"        TEXT NOT NULL PRIMARY KEY,
    "NUMERO"       TEXT,
    "AFEBUD_IDENT" TEXT,
    "DESIG"        TEXT,
    "STYLE"        INTEGER DEFAULT 0,
    "AFAFFA_IDENT" TEXT,
    "AFAFFA_CODE"  TEXT,
    "AFEBUD_PIECE" TEXT,
    "AFPRES_IDENT" TEXT,
    "AFPRES_CODE"  TEXT,
    "UNITE"        TEXT,
    "APPRO"        TEXT,
    "DATE_DEBUT"   DATE_TEXT,
    "DATE_FIN"     DATE_TEXT,
    "CHAPITRE2"    TEXT,
    "QBUD"         REAL DEFAULT 0,
    "VBUD_D"       DECIMAL_TEXT DEFAULT '0.00',
    "VENG"         DECIMAL_TEXT DEFAULT '0.00',
    "VREA"         DECIMAL_LIST_TEXT DEFAULT '0.00;0.00;0.00',
    "VRAF"         DECIMAL_LIST_TEXT DEFAULT '0.00;0.00;0.00',
    "AFFECTE"      TEXT DEFAULT 'N',
    "HBUD"         REAL DEFAULT 0,
    "HREA"         REAL DEFAULT 0,
    "HRAF"         REAL DEFAULT 0,
    "AVT"          REAL DEFAULT 0
);
CREATE INDEX IF NOT EXISTS "IX_AFLBUD_NUMERO" ON "AFLBUD" ("NUMERO");
CREATE INDEX IF NOT EXISTS "IX_AFLBUD_AFEBUD_IDENT" ON "AFLBUD" ("AFEBUD_IDENT");
CREATE INDEX IF NOT EXISTS "IX_AFLBUD_AFAFFA_IDENT" ON "AFLBUD" ("AFAFFA_IDENT");
CREATE INDEX IF NOT EXISTS "IX_AFLBUD_AFPRES_IDENT" ON "AFLBUD" ("AFPRES_IDENT");

CREATE TRIGGER IF NOT EXISTS "TR_AFLBUD_BUDGET_INS" AFTER INSERT ON "AFLBUD"
WHEN coalesce(NEW."AFEBUD_IDENT", '') = '' AND instr(coalesce(NEW."NUMERO", ''), '|') > 1
BEGIN
    UPDATE "AFLBUD"
       SET "AFEBUD_IDENT" = substr(NEW."NUMERO", 1, instr(NEW."NUMERO", '|') - 1)
     WHERE rowid = NEW.rowid;
END;

CREATE TRIGGER IF NOT EXISTS "TR_AFLBUD_BUDGET_UPD" AFTER UPDATE OF "NUMERO" ON "AFLBUD"
WHEN instr(coalesce(NEW."NUMERO", ''), '|') > 1
BEGIN
    UPDATE "AFLBUD"
       SET "AFEBUD_IDENT" = substr(NEW."NUMERO", 1, instr(NEW."NUMERO", '|') - 1)
     WHERE rowid = NEW.rowid;
END;

-- Results by project, purchase post and month (owner: AFRESU), kept by "MAJ_AFRESU" from
-- the committed amounts of orders and recomputed for a period by "CALCUL_RAF_D".
-- "ANNEE_MOIS" is 'yyyymm'; "TYPE" 'D' is the purchasing expense kind.
CREATE TABLE IF NOT EXISTS "AFRESU" (
    "AFAFFA_IDENT" TEXT NOT NULL,
    "AFPOST_CODE"  TEXT NOT NULL,
    "ANNEE_MOIS"   TEXT NOT NULL,
    "TYPE"         TEXT NOT NULL DEFAULT 'D',
    "VBUD_D"       DECIMAL_TEXT DEFAULT '0.00',   -- budgeted on the post
    "VENG"         DECIMAL_TEXT DEFAULT '0.00',   -- committed
    "VREA"         DECIMAL_TEXT DEFAULT '0.00',   -- realised
    "VRAF_D"       DECIMAL_TEXT DEFAULT '0.00',   -- remaining, as computed for the period
    "DATE_MAJ"     DATE_TEXT,
    "HEURE_MAJ"    TIME_TEXT,
    PRIMARY KEY ("AFAFFA_IDENT", "AFPOST_CODE", "ANNEE_MOIS", "TYPE")
);

-- Project accounting movements of purchasing pieces (owner: AFMOUV): one movement per piece
-- and budget line, generated when a receipt, invoice or time entry is linked and marked
-- deleted ("ETAT" 'S') then removed when the link goes. "CLE_COMPO" = component | IDENT.
CREATE TABLE IF NOT EXISTS "AFMOUV" (
    "IDENT"           TEXT NOT NULL PRIMARY KEY,
    "CLE_COMPO"       TEXT,
    "COMPOSANT"       TEXT,
    "COMPOSANT_IDENT" TEXT,
    "PIECE"           TEXT,
    "DATE_PIECE"      DATE_TEXT,
    "AFAFFA_IDENT"    TEXT,
    "AFLBUD_IDENT"    TEXT,
    "AFPOST_CODE"     TEXT,
    "ANNEE_MOIS"      TEXT,
    "QTE"             REAL DEFAULT 0,
    "MONTANT"         DECIMAL_TEXT DEFAULT '0.00',
    "ETAT"            TEXT DEFAULT 'G',            -- G generated, S marked deleted
    "DATE_MAJ"        DATE_TEXT,
    "HEURE_MAJ"       TIME_TEXT
);
CREATE INDEX IF NOT EXISTS "IX_AFMOUV_CLE_COMPO" ON "AFMOUV" ("CLE_COMPO");
CREATE INDEX IF NOT EXISTS "IX_AFMOUV_COMPOSANT" ON "AFMOUV" ("COMPOSANT", "COMPOSANT_IDENT");
CREATE INDEX IF NOT EXISTS "IX_AFMOUV_AFAFFA_IDENT" ON "AFMOUV" ("AFAFFA_IDENT");

-- Resources (owner: AFFOUR): people and suppliers seen from the project side. A supplier's
-- resource row carries the same IDENT as its GCPFOUR row.
CREATE TABLE IF NOT EXISTS "AFFOUR" (
    "IDENT"        TEXT NOT NULL PRIMARY KEY,
    "CODE"         TEXT,
    "NOM"          TEXT,
    "PRENOM"       TEXT,
    "DESIG"        TEXT,
    "CIVILITE"     TEXT,
    "AFSERV_IDENT" TEXT
);
CREATE INDEX IF NOT EXISTS "IX_AFFOUR_CODE" ON "AFFOUR" ("CODE");

-- Persons (owner: AFPERS). "AFFOUR_IDENT" is the person's resource; "CIVILITE" a title
-- code of SVCCIVIL; the person's code is the requester code of imported pieces.
CREATE TABLE IF NOT EXISTS "AFPERS" (
    "IDENT"        TEXT NOT NULL PRIMARY KEY,
    "CODE"         TEXT,
    "NOM"          TEXT,
    "PRENOM"       TEXT,
    "CIVILITE"     TEXT,
    "AFSERV_IDENT" TEXT,
    "AFFOUR_IDENT" TEXT
);
CREATE UNIQUE INDEX IF NOT EXISTS "UX_AFPERS_CODE" ON "AFPERS" ("CODE");
CREATE INDEX IF NOT EXISTS "IX_AFPERS_AFFOUR_IDENT" ON "AFPERS" ("AFFOUR_IDENT");

-- Time entries (owner: AFEFFO) and their lines AFLFFO (one line per project and service).
CREATE TABLE IF NOT EXISTS "AFEFFO" (
    "IDENT"         TEXT NOT NULL PRIMARY KEY,
    "NUMERO_DOC"    TEXT,
    "DESIG"         TEXT,
    "AFFOUR_IDENT"  TEXT,
    "DATE_PIECE"    DATE_TEXT,
    "DATE_CREATION" DATE_TEXT,
    "DATEM"         DATE_TEXT,                    -- date of the last change
    "HEUREM"        TIME_TEXT,                    -- time of the last change
    "DATE_MAJ"      DATE_TEXT,
    "HEURE_MAJ"     TIME_TEXT,
    "VALIDEE"       INTEGER DEFAULT 0
);
CREATE INDEX IF NOT EXISTS "IX_AFEFFO_NUMERO_DOC" ON "AFEFFO" ("NUMERO_DOC");
CREATE INDEX IF NOT EXISTS "IX_AFEFFO_DATE_PIECE" ON "AFEFFO" ("DATE_PIECE");

CREATE TABLE IF NOT EXISTS "AFLFFO" (
    "IDENT"        TEXT NOT NULL PRIMARY KEY,
    "NUMERO"       TEXT,                          -- time entry IDENT | line number
    "DESIG"        TEXT,
    "AFAFFA_IDENT" TEXT,
    "AFPRES_IDENT" TEXT,
    "QTE"          REAL DEFAULT 0,                -- hours
    "PUHT"         DECIMAL_TEXT DEFAULT '0.00',
    "HT"           DECIMAL_TEXT DEFAULT '0.00'
);
CREATE INDEX IF NOT EXISTS "IX_AFLFFO_NUMERO" ON "AFLFFO" ("NUMERO");

-- Time pointing of a link row (owner: AFPFST): hours of a person pointed against an
-- invoice or time entry linked to a personnel service.
CREATE TABLE IF NOT EXISTS "AFPFST" (
    "IDENT"         TEXT NOT NULL PRIMARY KEY,
    "QUARVO_IDENT"  TEXT,
    "AFPERS_IDENT"  TEXT,
    "AFFOUR_IDENT"  TEXT,
    "DATE_POINTAGE" DATE_TEXT,
    "QTE"           REAL DEFAULT 0,
    "HT"            DECIMAL_TEXT DEFAULT '0.00'
);
CREATE INDEX IF NOT EXISTS "IX_AFPFST_QUARVO_IDENT" ON "AFPFST" ("QUARVO_IDENT");

-- Analytical accounts (owner: AFCOMP), keyed by account number; "CPOST" is the
-- analytical (purchase) post the account feeds.
CREATE TABLE IF NOT EXISTS "AFCOMP" (
    "IDENT" TEXT NOT NULL PRIMARY KEY,            -- account number
    "CODE"  TEXT,
    "DESIG" TEXT,
    "CPOST" TEXT
);

-- Vocabulary of the project module (owner: AFVOCA): label and short label of a code.
CREATE TABLE IF NOT EXISTS "AFVOCA" (
    "IDENT" TEXT NOT NULL PRIMARY KEY,
    "CODE"  TEXT,
    "LABEL" TEXT,
    "BREF"  TEXT,
    "DESIG" TEXT
);
CREATE UNIQUE INDEX IF NOT EXISTS "UX_AFVOCA_CODE" ON "AFVOCA" ("CODE");

-- Civil titles (owner: SVCCIVIL).
CREATE TABLE IF NOT EXISTS "SVCCIVIL" (
    "IDENT" TEXT NOT NULL PRIMARY KEY,
    "CODE"  TEXT,
    "DESIG" TEXT,
    "BREF"  TEXT
);
CREATE UNIQUE INDEX IF NOT EXISTS "UX_SVCCIVIL_CODE" ON "SVCCIVIL" ("CODE");

-- Staging tables of the purchase import (owner: QUARVO), one per piece kind: quotes
-- requested from suppliers (DF), orders (CF), goods-received notes (BF), invoices (FF).
-- One row per line of the file; the lines of one piece share "NUMERO_DOC". All four have
-- the same columns so that one loader serves them: "BUDGET" is not read for DF,
-- "SOLDE" not for FF, "NUMERO", "TYPE" and "VALIDE" only for FF. "IDENT" is a surrogate
-- key in load order, given from the row id when the loader leaves it empty.
CREATE TABLE IF NOT EXISTS "IMM_PIECE_DF" (
    "IDENT"         TEXT PRIMARY KEY,
    "NUMERO_DOC"    TEXT,
    "DATE_CREATION" DATE_TEXT,
    "FOURNISSEUR"   TEXT,
    "AFFAIRE"       TEXT,
    "BUDGET"        TEXT,
    "ARTICLE"       TEXT,
    "DESIG"         TEXT,
    "QTE"           REAL DEFAULT 0,
    "PUHT"          DECIMAL_TEXT DEFAULT '0.00',
    "TAUX_REMISE"   REAL DEFAULT 0,
    "TAUX_TVA"      REAL,
    "REFERENCE"     TEXT,
    "ORIGINE"       TEXT,
    "DEMANDEUR"     TEXT,
    "SOLDE"         INTEGER DEFAULT 0,
    "NUMERO"        TEXT,
    "TYPE"          TEXT,
    "VALIDE"        INTEGER,
    "LIGNE_FICHIER" INTEGER                       -- line of the source file
);
CREATE INDEX IF NOT EXISTS "IX_IMM_PIECE_DF_NUMERO_DOC" ON "IMM_PIECE_DF" ("NUMERO_DOC");
CREATE TRIGGER IF NOT EXISTS "TR_IMM_PIECE_DF_IDENT" AFTER INSERT ON "IMM_PIECE_DF"
WHEN coalesce(NEW."IDENT", '') = ''
BEGIN
    UPDATE "IMM_PIECE_DF" SET "IDENT" = printf('%010d', NEW.rowid) WHERE rowid = NEW.rowid;
END;

CREATE TABLE IF NOT EXISTS "IMM_PIECE_CF" (
    "IDENT"         TEXT PRIMARY KEY,
    "NUMERO_DOC"    TEXT,
    "DATE_CREATION" DATE_TEXT,
    "FOURNISSEUR"   TEXT,
    "AFFAIRE"       TEXT,
    "BUDGET"        TEXT,
    "ARTICLE"       TEXT,
    "DESIG"         TEXT,
    "QTE"           REAL DEFAULT 0,
    "PUHT"          DECIMAL_TEXT DEFAULT '0.00',
    "TAUX_REMISE"   REAL DEFAULT 0,
    "TAUX_TVA"      REAL,
    "REFERENCE"     TEXT,
    "ORIGINE"       TEXT,
    "DEMANDEUR"     TEXT,
    "SOLDE"         INTEGER DEFAULT 0,
    "NUMERO"        TEXT,
    "TYPE"          TEXT,
    "VALIDE"        INTEGER,
    "LIGNE_FICHIER" INTEGER
);
CREATE INDEX IF NOT EXISTS "IX_IMM_PIECE_CF_NUMERO_DOC" ON "IMM_PIECE_CF" ("NUMERO_DOC");
CREATE TRIGGER IF NOT EXISTS "TR_IMM_PIECE_CF_IDENT" AFTER INSERT ON "IMM_PIECE_CF"
WHEN coalesce(NEW."IDENT", '') = ''
BEGIN
    UPDATE "IMM_PIECE_CF" SET "IDENT" = printf('%010d', NEW.rowid) WHERE rowid = NEW.rowid;
END;

CREATE TABLE IF NOT EXISTS "IMM_PIECE_BF" (
    "IDENT"         TEXT PRIMARY KEY,
    "NUMERO_DOC"    TEXT,
    "DATE_CREATION" DATE_TEXT,
    "FOURNISSEUR"   TEXT,
    "AFFAIRE"       TEXT,
    "BUDGET"        TEXT,
    "ARTICLE"       TEXT,
    "DESIG"         TEXT,
    "QTE"           REAL DEFAULT 0,
    "PUHT"          DECIMAL_TEXT DEFAULT '0.00',
    "TAUX_REMISE"   REAL DEFAULT 0,
    "TAUX_TVA"      REAL,
    "REFERENCE"     TEXT,
    "ORIGINE"       TEXT,
    "DEMANDEUR"     TEXT,
    "SOLDE"         INTEGER DEFAULT 0,
    "NUMERO"        TEXT,
    "TYPE"          TEXT,
    "VALIDE"        INTEGER,
    "LIGNE_FICHIER" INTEGER
);
CREATE INDEX IF NOT EXISTS "IX_IMM_PIECE_BF_NUMERO_DOC" ON "IMM_PIECE_BF" ("NUMERO_DOC");
CREATE TRIGGER IF NOT EXISTS "TR_IMM_PIECE_BF_IDENT" AFTER INSERT ON "IMM_PIECE_BF"
WHEN coalesce(NEW."IDENT", '') = ''
BEGIN
    UPDATE "IMM_PIECE_BF" SET "IDENT" = printf('%010d', NEW.rowid) WHERE rowid = NEW.rowid;
END;

CREATE TABLE IF NOT EXISTS "IMM_PIECE_FF" (
    "IDENT"         TEXT PRIMARY KEY,
    "NUMERO_DOC"    TEXT,
    "DATE_CREATION" DATE_TEXT,
    "FOURNISSEUR"   TEXT,
    "AFFAIRE"       TEXT,
    "BUDGET"        TEXT,
    "ARTICLE"       TEXT,
    "DESIG"         TEXT,
    "QTE"           REAL DEFAULT 0,
    "PUHT"          DECIMAL_TEXT DEFAULT '0.00',
    "TAUX_REMISE"   REAL DEFAULT 0,
    "TAUX_TVA"      REAL,
    "REFERENCE"     TEXT,
    "ORIGINE"       TEXT,
    "DEMANDEUR"     TEXT,
    "SOLDE"         INTEGER DEFAULT 0,
    "NUMERO"        TEXT,                         -- supplier's own invoice number
    "TYPE"          TEXT,                         -- F invoice, A credit note
    "VALIDE"        INTEGER,
    "LIGNE_FICHIER" INTEGER
);
CREATE INDEX IF NOT EXISTS "IX_IMM_PIECE_FF_NUMERO_DOC" ON "IMM_PIECE_FF" ("NUMERO_DOC");
CREATE TRIGGER IF NOT EXISTS "TR_IMM_PIECE_FF_IDENT" AFTER INSERT ON "IMM_PIECE_FF"
WHEN coalesce(NEW."IDENT", '') = ''
BEGIN
    UPDATE "IMM_PIECE_FF" SET "IDENT" = printf('%010d', NEW.rowid) WHERE rowid = NEW.rowid;
END;

-- Errors found by the import control and the accounting analysis (owner: QUARVO): one row
-- per fault. "COMPOSANT" names the staging table or piece table, "CODE" the document
-- number, "DESIG" the piece, "CMT" what is wrong. "IDENT" numbers go on from the highest.
CREATE TABLE IF NOT EXISTS "IMM_ERREUR" (
    "IDENT"     TEXT NOT NULL PRIMARY KEY,
    "COMPOSANT" TEXT,
    "CODE"      TEXT,
    "DESIG"     TEXT,
    "CMT"       TEXT
);
CREATE INDEX IF NOT EXISTS "IX_IMM_ERREUR_COMPOSANT" ON "IMM_ERREUR" ("COMPOSANT", "CODE");

------------------------------------------------------------------------------------------
-- Purchasing side (base GESCOM)
------------------------------------------------------------------------------------------

-- Purchasing parameters (owner: GCPPARAM) and purchasing settings of the site (owner:
-- GCPSTE). "SAISIE_ANA_A": 1 analytical section on the piece header, 2 on the lines.
-- "GCPDEPOT_IDENT" of GCPSTE is the depot of generated lines ("DEPOT").
CREATE TABLE IF NOT EXISTS "GCPPARAM" (
    "IDENT"        TEXT NOT NULL PRIMARY KEY,
    "DESIG"        TEXT,
    "SAISIE_ANA_A" INTEGER DEFAULT 0
);

CREATE TABLE IF NOT EXISTS "GCPSTE" (
    "IDENT"          TEXT NOT NULL PRIMARY KEY,
    "DESIG"          TEXT,
    "SAISIE_ANA_A"   INTEGER DEFAULT 0,
    "GCPDEPOT_IDENT" TEXT
);

-- Stock depots (owner: GCPDEPOT); "PRINCIPAL" 1 marks the main depot.
CREATE TABLE IF NOT EXISTS "GCPDEPOT" (
    "IDENT"     TEXT NOT NULL PRIMARY KEY,
    "CODE"      TEXT,
    "DESIG"     TEXT,
    "PRINCIPAL" INTEGER DEFAULT 0
);
CREATE UNIQUE INDEX IF NOT EXISTS "UX_GCPDEPOT_CODE" ON "GCPDEPOT" ("CODE");

-- Stock by item and depot (owner: GCPSTOCK): ordered quantities still expected are reduced
-- when an order or receipt line is settled.
CREATE TABLE IF NOT EXISTS "GCPSTOCK" (
    "IDENT"          TEXT NOT NULL PRIMARY KEY,
    "GCPARTIC_IDENT" TEXT,
    "GCPDEPOT_IDENT" TEXT,
    "QTE_STOCK"      REAL DEFAULT 0,
    "QTE_ATTENDUE"   REAL DEFAULT 0
);
CREATE UNIQUE INDEX IF NOT EXISTS "UX_GCPSTOCK_ARTICLE" ON "GCPSTOCK" ("GCPARTIC_IDENT", "GCPDEPOT_IDENT");

-- Purchasing criteria 1 to 3 of items (owners: GCPCRIT1..GCPCRIT3): the keys of purchase
-- grouping and of purchase accounts.
CREATE TABLE IF NOT EXISTS "GCPCRIT1" ("IDENT" TEXT NOT NULL PRIMARY KEY, "CODE" TEXT, "DESIG" TEXT);
CREATE TABLE IF NOT EXISTS "GCPCRIT2" ("IDENT" TEXT NOT NULL PRIMARY KEY, "CODE" TEXT, "DESIG" TEXT);
CREATE TABLE IF NOT EXISTS "GCPCRIT3" ("IDENT" TEXT NOT NULL PRIMARY KEY, "CODE" TEXT, "DESIG" TEXT);
CREATE UNIQUE INDEX IF NOT EXISTS "UX_GCPCRIT1_CODE" ON "GCPCRIT1" ("CODE");
CREATE UNIQUE INDEX IF NOT EXISTS "UX_GCPCRIT2_CODE" ON "GCPCRIT2" ("CODE");
CREATE UNIQUE INDEX IF NOT EXISTS "UX_GCPCRIT3_CODE" ON "GCPCRIT3" ("CODE");

-- Purchasing items (owner: GCPARTIC).
CREATE TABLE IF NOT EXISTS "GCPARTIC" (
    "IDENT"          TEXT NOT NULL PRIMARY KEY,
    "CODE"           TEXT,
    "DESIG"          TEXT,
    "UNITE"          TEXT,
    "PUHT"           DECIMAL_TEXT DEFAULT '0.00',
    "GCPCRIT1_IDENT" TEXT,
    "GCPCRIT2_IDENT" TEXT,
    "GCPCRIT3_IDENT" TEXT,
    "GCPTVA_IDENT"   TEXT
);
CREATE UNIQUE INDEX IF NOT EXISTS "UX_GCPARTIC_CODE" ON "GCPARTIC" ("CODE");

-- VAT regimes (owner: GCPREGM), VAT codes (owner: GCPTVA) and the rate of each code in
-- each regime (owner: GCPTVA, table GCPTXTVA).
CREATE TABLE IF NOT EXISTS "GCPREGM" (
    "IDENT" TEXT NOT NULL PRIMARY KEY,
    "CODE"  TEXT,
    "DESIG" TEXT
);
CREATE UNIQUE INDEX IF NOT EXISTS "UX_GCPREGM_CODE" ON "GCPREGM" ("CODE");

CREATE TABLE IF NOT EXISTS "GCPTVA" (
    "IDENT" TEXT NOT NULL PRIMARY KEY,
    "CODE"  TEXT,
    "DESIG" TEXT
);
CREATE UNIQUE INDEX IF NOT EXISTS "UX_GCPTVA_CODE" ON "GCPTVA" ("CODE");

CREATE TABLE IF NOT EXISTS "GCPTXTVA" (
    "IDENT"         TEXT NOT NULL PRIMARY KEY,
    "GCPREGM_IDENT" TEXT,
    "GCPTVA_IDENT"  TEXT,
    "TAUX"          REAL DEFAULT 0                -- rate in %
);
CREATE INDEX IF NOT EXISTS "IX_GCPTXTVA_REGIME" ON "GCPTXTVA" ("GCPREGM_IDENT", "TAUX");

-- Purchase accounts (owner: GCPTVA, answered by its "COMPTE_ACHAT"): the account of a
-- purchase by grouping criterion (item criterion or supplier family), VAT regime and VAT
-- code, within optional validity dates. An empty criterion or VAT code matches any; the
-- most precise valid row wins.
CREATE TABLE IF NOT EXISTS "GCPCPTACH" (
    "IDENT"          TEXT NOT NULL PRIMARY KEY,
    "CRITERE_IDENT"  TEXT,
    "GCPREGM_IDENT"  TEXT,
    "GCPTVA_IDENT"   TEXT,
    "DATE_DEBUT"     DATE_TEXT,
    "DATE_FIN"       DATE_TEXT,
    "COMPTE"         TEXT
);
CREATE INDEX IF NOT EXISTS "IX_GCPCPTACH_CLE" ON "GCPCPTACH" ("CRITERE_IDENT", "GCPREGM_IDENT");

-- Accounting link configuration read by "LECTURE_SIMPLE" (kind, key -> value): GCPCOMPT
-- when the accounting is integrated, GCPTCFG otherwise (owners: GCPCOMPT, GCPTCFG).
-- Keys: kind 'J' "ACHAT" purchases journal; kind '*' "MACHAT" account grouping mode 0..3;
-- kind 'C' "AFRAIS" fees account, "APORT" carriage account.
CREATE TABLE IF NOT EXISTS "GCPCOMPT" (
    "GENRE"  TEXT NOT NULL,
    "CLE"    TEXT NOT NULL,
    "VALEUR" TEXT,
    "DESIG"  TEXT,
    PRIMARY KEY ("GENRE", "CLE")
);

CREATE TABLE IF NOT EXISTS "GCPTCFG" (
    "GENRE"  TEXT NOT NULL,
    "CLE"    TEXT NOT NULL,
    "VALEUR" TEXT,
    "DESIG"  TEXT,
    PRIMARY KEY ("GENRE", "CLE")
);

-- Integrated accounting parameters (owner: CPPARAM); a row means the accounting is set up.
CREATE TABLE IF NOT EXISTS "CPPARAM" (
    "IDENT"         TEXT NOT NULL PRIMARY KEY,
    "CODE"          TEXT,
    "DESIG"         TEXT,
    "JOURNAL_ACHAT" TEXT
);

-- Payment terms (owner: GCPREG): due date = piece date + "NB_JOURS", then end of month
-- when "FIN_MOIS" is 1.
CREATE TABLE IF NOT EXISTS "GCPREG" (
    "IDENT"    TEXT NOT NULL PRIMARY KEY,
    "CODE"     TEXT,
    "DESIG"    TEXT,
    "NB_JOURS" INTEGER DEFAULT 0,
    "FIN_MOIS" INTEGER DEFAULT 0
);
CREATE UNIQUE INDEX IF NOT EXISTS "UX_GCPREG_CODE" ON "GCPREG" ("CODE");

-- Supplier families (owner: GAPFFOU): grouping criterion 0 of purchase accounts.
CREATE TABLE IF NOT EXISTS "GAPFFOU" (
    "IDENT" TEXT NOT NULL PRIMARY KEY,
    "CODE"  TEXT,
    "DESIG" TEXT
);
CREATE UNIQUE INDEX IF NOT EXISTS "UX_GAPFFOU_CODE" ON "GAPFFOU" ("CODE");

-- Suppliers (owner: GCPFOUR).
CREATE TABLE IF NOT EXISTS "GCPFOUR" (
    "IDENT"         TEXT NOT NULL PRIMARY KEY,
    "CODE"          TEXT,
    "DESIG"         TEXT,
    "GCPREGM_IDENT" TEXT,                         -- VAT regime
    "GAPFFOU_IDENT" TEXT,                         -- supplier family
    "GCPREG_IDENT"  TEXT                          -- payment terms
);
CREATE UNIQUE INDEX IF NOT EXISTS "UX_GCPFOUR_CODE" ON "GCPFOUR" ("CODE");

-- Item-supplier links (owner: GAPARTFO), created on demand by "LECTURE_ET_CREATION".
CREATE TABLE IF NOT EXISTS "GAPARTFO" (
    "IDENT"          TEXT NOT NULL PRIMARY KEY,
    "GCPARTIC_IDENT" TEXT,
    "GCPFOUR_IDENT"  TEXT,
    "REFERENCE"      TEXT,
    "PUHT"           DECIMAL_TEXT DEFAULT '0.00'
);
CREATE UNIQUE INDEX IF NOT EXISTS "UX_GAPARTFO_LIEN" ON "GAPARTFO" ("GCPARTIC_IDENT", "GCPFOUR_IDENT");

-- Requesters of purchases (owner: GAPAPPOR).
CREATE TABLE IF NOT EXISTS "GAPAPPOR" (
    "IDENT"    TEXT NOT NULL PRIMARY KEY,
    "CODE"     TEXT,
    "NOM"      TEXT,
    "PRENOM"   TEXT,
    "CIVILITE" TEXT,                              -- title in full
    "SERVICE"  TEXT                               -- department in full
);
CREATE UNIQUE INDEX IF NOT EXISTS "UX_GAPAPPOR_CODE" ON "GAPAPPOR" ("CODE");

-- Purchasing piece headers (owners: GAPEDEV quotes requested from suppliers, GAPECOM
-- supplier orders, GAPEBL goods-received notes, GAPEFAC supplier invoices), all with the
-- same columns. "VALIDEE"/"SOLDEE" 1 when validated/settled. "QTT" quantity carried
-- forward to later pieces, "QTNT" quantity not yet carried forward. "BRUT" is the sum of
-- the lines' "HT"; "HT" = "BRUT" less the header discount and prompt-payment discount,
-- plus "PORT_HT" and "FRAIS_HT"; "TTC" adds VAT; "MTNT_HT"/"MTNT_TTC" are the amounts
-- already carried forward. Invoice "TYPE": 'F' invoice, 'A' credit note (amounts stored
-- positive; the credit-note sign is applied by whoever sums them).
CREATE TABLE IF NOT EXISTS "GAPEDEV" (
    "IDENT"          TEXT NOT NULL PRIMARY KEY,
    "NUMERO_DOC"     TEXT,
    "NUMERO"         TEXT,
    "DESIG"          TEXT,
    "ORIGINE"        TEXT,
    "TYPE"           TEXT,
    "DATE_CREATION"  DATE_TEXT,
    "DATE_MAJ"       DATE_TEXT,
    "HEURE_MAJ"      TIME_TEXT,
    "VALIDEE"        INTEGER DEFAULT 0,
    "SOLDEE"         INTEGER DEFAULT 0,
    "SECAN_CODE"     TEXT,
    "GAPAPPOR_IDENT" TEXT,
    "GCPFOUR_IDENT"  TEXT,
    "GCPREG_IDENT"   TEXT,
    "GCPREGM_IDENT"  TEXT,
    "GCPDEPOT_IDENT" TEXT,
    "TAUX_REMISE"    REAL DEFAULT 0,
    "TAUX_ESCOMPTE"  REAL DEFAULT 0,
    "BRUT"           DECIMAL_TEXT DEFAULT '0.00',
    "PORT_HT"        DECIMAL_TEXT DEFAULT '0.00',
    "FRAIS_HT"       DECIMAL_TEXT DEFAULT '0.00',
    "HT"             DECIMAL_TEXT DEFAULT '0.00',
    "TTC"            DECIMAL_TEXT DEFAULT '0.00',
    "NET_A_PAYER"    DECIMAL_TEXT DEFAULT '0.00',
    "MTNT_HT"        DECIMAL_TEXT DEFAULT '0.00',
    "MTNT_TTC"       DECIMAL_TEXT DEFAULT '0.00',
    "QTT"            REAL DEFAULT 0,
    "QTNT"           REAL DEFAULT 0
);
CREATE INDEX IF NOT EXISTS "IX_GAPEDEV_NUMERO_DOC" ON "GAPEDEV" ("NUMERO_DOC");
CREATE INDEX IF NOT EXISTS "IX_GAPEDEV_DATE_CREATION" ON "GAPEDEV" ("DATE_CREATION");

CREATE TABLE IF NOT EXISTS "GAPECOM" (
    "IDENT"          TEXT NOT NULL PRIMARY KEY,
    "NUMERO_DOC"     TEXT,
    "NUMERO"         TEXT,
    "DESIG"          TEXT,
    "ORIGINE"        TEXT,
    "TYPE"           TEXT,
    "DATE_CREATION"  DATE_TEXT,
    "DATE_MAJ"       DATE_TEXT,
    "HEURE_MAJ"      TIME_TEXT,
    "VALIDEE"        INTEGER DEFAULT 0,
    "SOLDEE"         INTEGER DEFAULT 0,
    "SECAN_CODE"     TEXT,
    "GAPAPPOR_IDENT" TEXT,
    "GCPFOUR_IDENT"  TEXT,
    "GCPREG_IDENT"   TEXT,
    "GCPREGM_IDENT"  TEXT,
    "GCPDEPOT_IDENT" TEXT,
    "TAUX_REMISE"    REAL DEFAULT 0,
    "TAUX_ESCOMPTE"  REAL DEFAULT 0,
    "BRUT"           DECIMAL_TEXT DEFAULT '0.00',
    "PORT_HT"        DECIMAL_TEXT DEFAULT '0.00',
    "FRAIS_HT"       DECIMAL_TEXT DEFAULT '0.00',
    "HT"             DECIMAL_TEXT DEFAULT '0.00',
    "TTC"            DECIMAL_TEXT DEFAULT '0.00',
    "NET_A_PAYER"    DECIMAL_TEXT DEFAULT '0.00',
    "MTNT_HT"        DECIMAL_TEXT DEFAULT '0.00',
    "MTNT_TTC"       DECIMAL_TEXT DEFAULT '0.00',
    "QTT"            REAL DEFAULT 0,
    "QTNT"           REAL DEFAULT 0
);
CREATE INDEX IF NOT EXISTS "IX_GAPECOM_NUMERO_DOC" ON "GAPECOM" ("NUMERO_DOC");
CREATE INDEX IF NOT EXISTS "IX_GAPECOM_DATE_CREATION" ON "GAPECOM" ("DATE_CREATION");

CREATE TABLE IF NOT EXISTS "GAPEBL" (
    "IDENT"          TEXT NOT NULL PRIMARY KEY,
    "NUMERO_DOC"     TEXT,
    "NUMERO"         TEXT,
    "DESIG"          TEXT,
    "ORIGINE"        TEXT,
    "TYPE"           TEXT,
    "DATE_CREATION"  DATE_TEXT,
    "DATE_MAJ"       DATE_TEXT,
    "HEURE_MAJ"      TIME_TEXT,
    "VALIDEE"        INTEGER DEFAULT 0,
    "SOLDEE"         INTEGER DEFAULT 0,
    "SECAN_CODE"     TEXT,
    "GAPAPPOR_IDENT" TEXT,
    "GCPFOUR_IDENT"  TEXT,
    "GCPREG_IDENT"   TEXT,
    "GCPREGM_IDENT"  TEXT,
    "GCPDEPOT_IDENT" TEXT,
    "TAUX_REMISE"    REAL DEFAULT 0,
    "TAUX_ESCOMPTE"  REAL DEFAULT 0,
    "BRUT"           DECIMAL_TEXT DEFAULT '0.00',
    "PORT_HT"        DECIMAL_TEXT DEFAULT '0.00',
    "FRAIS_HT"       DECIMAL_TEXT DEFAULT '0.00',
    "HT"             DECIMAL_TEXT DEFAULT '0.00',
    "TTC"            DECIMAL_TEXT DEFAULT '0.00',
    "NET_A_PAYER"    DECIMAL_TEXT DEFAULT '0.00',
    "MTNT_HT"        DECIMAL_TEXT DEFAULT '0.00',
    "MTNT_TTC"       DECIMAL_TEXT DEFAULT '0.00',
    "QTT"            REAL DEFAULT 0,
    "QTNT"           REAL DEFAULT 0
);
CREATE INDEX IF NOT EXISTS "IX_GAPEBL_NUMERO_DOC" ON "GAPEBL" ("NUMERO_DOC");
CREATE INDEX IF NOT EXISTS "IX_GAPEBL_DATE_CREATION" ON "GAPEBL" ("DATE_CREATION");

CREATE TABLE IF NOT EXISTS "GAPEFAC" (
    "IDENT"          TEXT NOT NULL PRIMARY KEY,
    "NUMERO_DOC"     TEXT,
    "NUMERO"         TEXT,                        -- supplier's own invoice number
    "DESIG"          TEXT,
    "ORIGINE"        TEXT,
    "TYPE"           TEXT,                        -- F invoice, A credit note
    "DATE_CREATION"  DATE_TEXT,
    "DATE_MAJ"       DATE_TEXT,
    "HEURE_MAJ"      TIME_TEXT,
    "VALIDEE"        INTEGER DEFAULT 0,
    "SOLDEE"         INTEGER DEFAULT 0,
    "SECAN_CODE"     TEXT,
    "GAPAPPOR_IDENT" TEXT,
    "GCPFOUR_IDENT"  TEXT,
    "GCPREG_IDENT"   TEXT,
    "GCPREGM_IDENT"  TEXT,
    "GCPDEPOT_IDENT" TEXT,
    "TAUX_REMISE"    REAL DEFAULT 0,
    "TAUX_ESCOMPTE"  REAL DEFAULT 0,
    "BRUT"           DECIMAL_TEXT DEFAULT '0.00',
    "PORT_HT"        DECIMAL_TEXT DEFAULT '0.00',
    "FRAIS_HT"       DECIMAL_TEXT DEFAULT '0.00',
    "HT"             DECIMAL_TEXT DEFAULT '0.00',
    "TTC"            DECIMAL_TEXT DEFAULT '0.00',
    "NET_A_PAYER"    DECIMAL_TEXT DEFAULT '0.00',
    "MTNT_HT"        DECIMAL_TEXT DEFAULT '0.00',
    "MTNT_TTC"       DECIMAL_TEXT DEFAULT '0.00',
    "QTT"            REAL DEFAULT 0,
    "QTNT"           REAL DEFAULT 0
);
CREATE INDEX IF NOT EXISTS "IX_GAPEFAC_NUMERO_DOC" ON "GAPEFAC" ("NUMERO_DOC");
CREATE INDEX IF NOT EXISTS "IX_GAPEFAC_DATE_CREATION" ON "GAPEFAC" ("DATE_CREATION");

-- Purchasing piece lines (owners: GAPLDEV, GAPLCOM, GAPLBL, GAPLFAC), all with the same
-- columns. "NUMERO" = header IDENT | line number: the link to the header, searched by
-- prefix. "BRUT" = "QTE" x "PUHT"; "HT" = "BRUT" less the line discount "TAUX_REMISE" %.
-- "QTT" quantity carried forward, "QTE_SOLDEE" quantity settled without being carried.
-- "STYLE" 2 marks a comment line without item.
CREATE TABLE IF NOT EXISTS "GAPLDEV" (
    "IDENT"          TEXT NOT NULL PRIMARY KEY,
    "NUMERO"         TEXT,
    "TYPE"           TEXT,
    "STYLE"          INTEGER DEFAULT 0,
    "GCPARTIC_IDENT" TEXT,
    "GCPARTIC_CODE"  TEXT,
    "DESIG"          TEXT,
    "SECAN_CODE"     TEXT,
    "GCPDEPOT_IDENT" TEXT,
    "GCPTVA_IDENT"   TEXT,
    "QTE"            REAL DEFAULT 0,
    "QTE_SOLDEE"     REAL DEFAULT 0,
    "QTT"            REAL DEFAULT 0,
    "PUHT"           DECIMAL_TEXT DEFAULT '0.00',
    "TAUX_REMISE"    REAL DEFAULT 0,
    "TAUX_ESCOMPTE"  REAL DEFAULT 0,
    "BRUT"           DECIMAL_TEXT DEFAULT '0.00',
    "PORT_HT"        DECIMAL_TEXT DEFAULT '0.00',
    "FRAIS_HT"       DECIMAL_TEXT DEFAULT '0.00',
    "HT"             DECIMAL_TEXT DEFAULT '0.00'
);
CREATE UNIQUE INDEX IF NOT EXISTS "UX_GAPLDEV_NUMERO" ON "GAPLDEV" ("NUMERO");

CREATE TABLE IF NOT EXISTS "GAPLCOM" (
    "IDENT"          TEXT NOT NULL PRIMARY KEY,
    "NUMERO"         TEXT,
    "TYPE"           TEXT,
    "STYLE"          INTEGER DEFAULT 0,
    "GCPARTIC_IDENT" TEXT,
    "GCPARTIC_CODE"  TEXT,
    "DESIG"          TEXT,
    "SECAN_CODE"     TEXT,
    "GCPDEPOT_IDENT" TEXT,
    "GCPTVA_IDENT"   TEXT,
    "QTE"            REAL DEFAULT 0,
    "QTE_SOLDEE"     REAL DEFAULT 0,
    "QTT"            REAL DEFAULT 0,
    "PUHT"           DECIMAL_TEXT DEFAULT '0.00',
    "TAUX_REMISE"    REAL DEFAULT 0,
    "TAUX_ESCOMPTE"  REAL DEFAULT 0,
    "BRUT"           DECIMAL_TEXT DEFAULT '0.00',
    "PORT_HT"        DECIMAL_TEXT DEFAULT '0.00',
    "FRAIS_HT"       DECIMAL_TEXT DEFAULT '0.00',
    "HT"             DECIMAL_TEXT DEFAULT '0.00'
);
CREATE UNIQUE INDEX IF NOT EXISTS "UX_GAPLCOM_NUMERO" ON "GAPLCOM" ("NUMERO");

CREATE TABLE IF NOT EXISTS "GAPLBL" (
    "IDENT"          TEXT NOT NULL PRIMARY KEY,
    "NUMERO"         TEXT,
    "TYPE"           TEXT,
    "STYLE"          INTEGER DEFAULT 0,
    "GCPARTIC_IDENT" TEXT,
    "GCPARTIC_CODE"  TEXT,
    "DESIG"          TEXT,
    "SECAN_CODE"     TEXT,
    "GCPDEPOT_IDENT" TEXT,
    "GCPTVA_IDENT"   TEXT,
    "QTE"            REAL DEFAULT 0,
    "QTE_SOLDEE"     REAL DEFAULT 0,
    "QTT"            REAL DEFAULT 0,
    "PUHT"           DECIMAL_TEXT DEFAULT '0.00',
    "TAUX_REMISE"    REAL DEFAULT 0,
    "TAUX_ESCOMPTE"  REAL DEFAULT 0,
    "BRUT"           DECIMAL_TEXT DEFAULT '0.00',
    "PORT_HT"        DECIMAL_TEXT DEFAULT '0.00',
    "FRAIS_HT"       DECIMAL_TEXT DEFAULT '0.00',
    "HT"             DECIMAL_TEXT DEFAULT '0.00'
);
CREATE UNIQUE INDEX IF NOT EXISTS "UX_GAPLBL_NUMERO" ON "GAPLBL" ("NUMERO");

CREATE TABLE IF NOT EXISTS "GAPLFAC" (
    "IDENT"          TEXT NOT NULL PRIMARY KEY,
    "NUMERO"         TEXT,
    "TYPE"           TEXT,
    "STYLE"          INTEGER DEFAULT 0,
    "GCPARTIC_IDENT" TEXT,
    "GCPARTIC_CODE"  TEXT,
    "DESIG"          TEXT,
    "SECAN_CODE"     TEXT,
    "GCPDEPOT_IDENT" TEXT,
    "GCPTVA_IDENT"   TEXT,
    "QTE"            REAL DEFAULT 0,
    "QTE_SOLDEE"     REAL DEFAULT 0,
    "QTT"            REAL DEFAULT 0,
    "PUHT"           DECIMAL_TEXT DEFAULT '0.00',
    "TAUX_REMISE"    REAL DEFAULT 0,
    "TAUX_ESCOMPTE"  REAL DEFAULT 0,
    "BRUT"           DECIMAL_TEXT DEFAULT '0.00',
    "PORT_HT"        DECIMAL_TEXT DEFAULT '0.00',
    "FRAIS_HT"       DECIMAL_TEXT DEFAULT '0.00',
    "HT"             DECIMAL_TEXT DEFAULT '0.00'
);
CREATE UNIQUE INDEX IF NOT EXISTS "UX_GAPLFAC_NUMERO" ON "GAPLFAC" ("NUMERO");

-- Chaining of purchasing pieces (owner: the purchasing modules, written by transformation):
-- one row per source line carried into a later piece. "CLE_SRC" = source type code | source
-- IDENT | source line number; type codes -1 quote request, -2 order, -3 goods-received
-- note, -4 invoice. "IDE_DST" is the downstream piece, "LIG_DST" its line number.
CREATE TABLE IF NOT EXISTS "CHAINAGE" (
    "CLE_SRC"  TEXT NOT NULL,
    "TYPE_DST" INTEGER NOT NULL,
    "IDE_DST"  TEXT NOT NULL,
    "LIG_DST"  TEXT,
    PRIMARY KEY ("CLE_SRC", "TYPE_DST", "IDE_DST")
);

-- Due dates of supplier invoices (owner: GAPECH), created by "CREER_DEFAUT".
CREATE TABLE IF NOT EXISTS "GAPECH" (
    "IDENT"          TEXT NOT NULL PRIMARY KEY,
    "GAPEFAC_IDENT"  TEXT,
    "NUMERO_DOC"     TEXT,
    "NUMERO"         INTEGER DEFAULT 1,           -- rank of the due date
    "GCPFOUR_IDENT"  TEXT,
    "GCPREG_IDENT"   TEXT,
    "DATE_ECHEANCE"  DATE_TEXT,
    "MONTANT"        DECIMAL_TEXT DEFAULT '0.00'
);
CREATE INDEX IF NOT EXISTS "IX_GAPECH_GAPEFAC_IDENT" ON "GAPECH" ("GAPEFAC_IDENT");

-- Lots attached to order and receipt lines (owner: GAPLOT). "TYPE_PIECE" is the piece type
-- code, "LIGNE_IDENT" the line; "SOLDE" 1 once the lot is settled.
CREATE TABLE IF NOT EXISTS "GAPLOT" (
    "IDENT"          TEXT NOT NULL PRIMARY KEY,
    "TYPE_PIECE"     INTEGER,
    "PIECE_IDENT"    TEXT,
    "LIGNE_IDENT"    TEXT,
    "GCPARTIC_IDENT" TEXT,
    "NUMERO_LOT"     TEXT,
    "QTE"            REAL DEFAULT 0,
    "SOLDE"          INTEGER DEFAULT 0
);
CREATE INDEX IF NOT EXISTS "IX_GAPLOT_LIGNE" ON "GAPLOT" ("TYPE_PIECE", "PIECE_IDENT", "LIGNE_IDENT");

------------------------------------------------------------------------------------------
-- Runtime, rights and shared services (base $$)
------------------------------------------------------------------------------------------

-- Document numbering counters (owner: ZUMNDOC): the last number given per module (table),
-- counter name and base. "ATTRIBUE_NUMERO" hands out "DERNIER" + 1 as a 10-digit text.
CREATE TABLE IF NOT EXISTS "ZUMNDOC" (
    "MODULE"  TEXT NOT NULL,
    "NOM"     TEXT NOT NULL,
    "BASE"    TEXT NOT NULL,
    "DERNIER" INTEGER NOT NULL DEFAULT 0,
    PRIMARY KEY ("MODULE", "NOM", "BASE")
);

-- Applications (owner: SYSAPPLI); the project application is 'DOVERUVA'.
CREATE TABLE IF NOT EXISTS "SYSAPPLI" (
    "IDENT" TEXT NOT NULL PRIMARY KEY,
    "CODE"  TEXT,
    "DESIG" TEXT
);
CREATE UNIQUE INDEX IF NOT EXISTS "UX_SYSAPPLI_CODE" ON "SYSAPPLI" ("CODE");

-- Users (owner: SYSDROIT).
CREATE TABLE IF NOT EXISTS "SYSUTIL" (
    "IDENT" TEXT NOT NULL PRIMARY KEY,
    "CODE"  TEXT,
    "NOM"   TEXT
);
CREATE UNIQUE INDEX IF NOT EXISTS "UX_SYSUTIL_CODE" ON "SYSUTIL" ("CODE");

-- Rights of a user in an application (owner: SYSDROIT): "DROITS" is a set of letters,
-- V view, C create, M modify, S delete, A cancel, I print.
CREATE TABLE IF NOT EXISTS "SYSDROIT" (
    "IDENT"          TEXT NOT NULL PRIMARY KEY,
    "SYSAPPLI_IDENT" TEXT,
    "UTILISATEUR"    TEXT,
    "DROITS"         TEXT DEFAULT ''
);
CREATE UNIQUE INDEX IF NOT EXISTS "UX_SYSDROIT_USER" ON "SYSDROIT" ("SYSAPPLI_IDENT", "UTILISATEUR");

-- Installed optional components (owner: SYSCOMPO), e.g. 'QUARVO_IMPORTER'.
CREATE TABLE IF NOT EXISTS "SYSCOMPO" (
    "IDENT" TEXT NOT NULL PRIMARY KEY,
    "CODE"  TEXT,
    "DESIG" TEXT
);
CREATE UNIQUE INDEX IF NOT EXISTS "UX_SYSCOMPO_CODE" ON "SYSCOMPO" ("CODE");

-- User preferences (owner: ACTION, "LIT_PREF"/"ECRIT_PREF"): one value per automaton,
-- user and key (the export file name of the follow-up report has an empty key).
CREATE TABLE IF NOT EXISTS "ACTPREF" (
    "AUTOMATE"    TEXT NOT NULL,
    "UTILISATEUR" TEXT NOT NULL,
    "CLE"         TEXT NOT NULL DEFAULT '',
    "VALEUR"      TEXT,
    PRIMARY KEY ("AUTOMATE", "UTILISATEUR", "CLE")
);

-- Exchange formats of the runtime's loader and export engine (owner: runtime, base $$).
-- 'EXCEL1': tab-separated text, extension TXT, first line the column names.
CREATE TABLE IF NOT EXISTS "FRMT" (
    "CODE"        TEXT NOT NULL PRIMARY KEY,
    "DESIG"       TEXT,
    "EXT"         TEXT,
    "SEPARATEUR"  TEXT DEFAULT 'TAB',
    "FORMAT_DATE" TEXT DEFAULT 'dd/mm/yyyy',
    "ENCODAGE"    TEXT DEFAULT 'UTF-8'
);
