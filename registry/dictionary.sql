-- Schema of a dossier: one SQLite file per dossier, accounting base "CP".
--
-- Table and column names are those the modules bind, verbatim and upper case, so any
-- SQL client can read a dossier. Every column is NOT NULL with a default, and the first
-- word of its declared type says what kind of value it carries (the cursor layer reads
-- it back from PRAGMA table_info):
--
--   TEXT           text: codes, labels, identifiers ('' when empty)
--   DATE TEXT      a calendar date as 'YYYY-MM-DD', '' when empty, so text order is date order
--   MONEY TEXT     an exact decimal amount as text: '119.6', '-0.12', '0'; never a float
--   RATE REAL      a VAT rate in percent or an exchange rate
--   INTEGER        a number or a ledger identifier (UNIQ, NUSYS, MOUVE_UNIQ...)
--
-- Keys are PRIMARY KEY constraints on ordinary rowid tables. A named index of the
-- dictionary ("INDX1", "INDX2") is created as "<TABLE>_<NAME>" because SQLite index
-- names are global; a plain index for a list order is named "<TABLE>_<COLUMN>".
--
-- The rows of one operation hang together by key prefix:
--   MIRVAE.IDENT     '00000042'
--   MIRVAL.NUMERO    '00000042|000001'   the operation's IDENT, '|', the line order on 6 digits
--   MIRVAANA.NUMERO  '00000107|'         the line's IDENT and '|'
--   MIRVAJUS.IDENTR  '00000107'          the line's IDENT
-- so that a prefix selects one operation's (or one line's) rows in key order.

------------------------------------------------------------------------------------------
-- Own tables: written, replaced and deleted with their operation.
------------------------------------------------------------------------------------------

-- Operation header. TYPE is "FC", "FF", "NDF", "BQ", "CA" or "OD"; amounts are in the
-- entry currency MONNAIE_IDENT at rate COURS.
CREATE TABLE "MIRVAE" (
  "IDENT"          TEXT       NOT NULL DEFAULT '',
  "TYPE"           TEXT       NOT NULL DEFAULT '',
  "DTOPE"          DATE TEXT  NOT NULL DEFAULT '',
  "NUMCP"          TEXT       NOT NULL DEFAULT '',  -- client, supplier, staff, bank or cash account
  "NUMJL"          TEXT       NOT NULL DEFAULT '',
  "NPIEC"          TEXT       NOT NULL DEFAULT '',  -- piece number, '[PIECE]' until drawn
  "INPIE"          TEXT       NOT NULL DEFAULT '',  -- piece label
  "NPIES"          TEXT       NOT NULL DEFAULT '',  -- ledger piece made from it, '' until posted
  "MONNAIE_IDENT"  TEXT       NOT NULL DEFAULT '',
  "COURS"          RATE REAL  NOT NULL DEFAULT 0,
  "DTECH"          DATE TEXT  NOT NULL DEFAULT '',
  "SAISIE_MTT"     TEXT       NOT NULL DEFAULT '',  -- "1" lines typed excluding tax, "2" including tax
  "HT"             MONEY TEXT NOT NULL DEFAULT '0',
  "TVA"            MONEY TEXT NOT NULL DEFAULT '0',
  "TTC"            MONEY TEXT NOT NULL DEFAULT '0',
  "TYPE_DR"        TEXT       NOT NULL DEFAULT '',  -- bank and cash: "R" receipt, "D" disbursement
  "DEBPIS"         MONEY TEXT NOT NULL DEFAULT '0', -- miscellaneous: debit total of the piece
  "CREPIS"         MONEY TEXT NOT NULL DEFAULT '0', -- miscellaneous: credit total of the piece
  "DATEC"          DATE TEXT  NOT NULL DEFAULT '',
  "HEUREC"         TEXT       NOT NULL DEFAULT '',
  "DATEM"          DATE TEXT  NOT NULL DEFAULT '',
  "HEUREM"         TEXT       NOT NULL DEFAULT '',
  "USERM"          TEXT       NOT NULL DEFAULT '',
  PRIMARY KEY ("IDENT")
);
CREATE INDEX "MIRVAE_INDX1" ON "MIRVAE" ("TYPE", "DTOPE", "NPIEC", "IDENT");
-- A browser limited to one account (a client, a bank) or to one piece number reads it
-- in the same order.
CREATE INDEX "MIRVAE_COMPTE" ON "MIRVAE" ("TYPE", "NUMCP", "DTOPE", "NPIEC", "IDENT");
CREATE INDEX "MIRVAE_PIECE" ON "MIRVAE" ("TYPE", "NPIEC", "DTOPE", "IDENT");
CREATE INDEX "MIRVAE_NPIES" ON "MIRVAE" ("NPIES");

-- Operation lines. IDENT is the line's own identifier (8 characters, "NDOC" counter).
CREATE TABLE "MIRVAL" (
  "IDENT"          TEXT       NOT NULL DEFAULT '',
  "NUMERO"         TEXT       NOT NULL DEFAULT '',  -- operation IDENT || '|' || order on 6 digits
  "NUMCP"          TEXT       NOT NULL DEFAULT '',
  "LIBEC"          TEXT       NOT NULL DEFAULT '',
  "COTVA"          TEXT       NOT NULL DEFAULT '',
  "TXTVA"          RATE REAL  NOT NULL DEFAULT 0,   -- percent: 19.6 is 19.6 %
  "HT"             MONEY TEXT NOT NULL DEFAULT '0',
  "TVA"            MONEY TEXT NOT NULL DEFAULT '0',
  "TTC"            MONEY TEXT NOT NULL DEFAULT '0',
  "CPOST"          TEXT       NOT NULL DEFAULT '',
  "CCRIT"          TEXT       NOT NULL DEFAULT '',
  "SENS_DC"        TEXT       NOT NULL DEFAULT '',  -- miscellaneous: "D" or "C"
  "MTDEBS"         MONEY TEXT NOT NULL DEFAULT '0', -- miscellaneous: debit in entry currency
  "MTCRES"         MONEY TEXT NOT NULL DEFAULT '0', -- miscellaneous: credit in entry currency
  "MOUVE_UNIQ"     INTEGER    NOT NULL DEFAULT 0,   -- ledger movement made from the line
  PRIMARY KEY ("NUMERO")
);
CREATE INDEX "MIRVAL_IDENT" ON "MIRVAL" ("IDENT");

-- Analytic breakdown of a line, amounts in the entry currency.
CREATE TABLE "MIRVAANA" (
  "IDENT"          TEXT       NOT NULL DEFAULT '',
  "NUMERO"         TEXT       NOT NULL DEFAULT '',  -- line IDENT || '|'
  "CSECT"          TEXT       NOT NULL DEFAULT '',
  "MTADE"          MONEY TEXT NOT NULL DEFAULT '0',
  "MTACR"          MONEY TEXT NOT NULL DEFAULT '0',
  PRIMARY KEY ("NUMERO", "IDENT")
);
-- The identifier counter reads the largest IDENT at each draw.
CREATE INDEX "MIRVAANA_IDENT" ON "MIRVAANA" ("IDENT");

-- Due dates of the ledger settled by a bank or cash line.
CREATE TABLE "MIRVAJUS" (
  "IDENTR"         TEXT       NOT NULL DEFAULT '',  -- the settling MIRVAL line
  "NUSYS"          INTEGER    NOT NULL DEFAULT 0,   -- ECHEA.NUSYS
  "MTREG"          MONEY TEXT NOT NULL DEFAULT '0', -- settled, keeping currency
  "MTREGS"         MONEY TEXT NOT NULL DEFAULT '0', -- settled, settlement currency
  "MTEEUR"         MONEY TEXT NOT NULL DEFAULT '0', -- rounding difference, keeping currency
  "MTECHG"         MONEY TEXT NOT NULL DEFAULT '0', -- exchange gain or loss, keeping currency
  PRIMARY KEY ("IDENTR", "NUSYS")
);

------------------------------------------------------------------------------------------
-- Work tables. These are templates: each user session works on its own copies, shared by
-- the screens of that session.
------------------------------------------------------------------------------------------

-- The one line handed to the analytic screen: a copy of the MIRVAL row.
CREATE TABLE "MIRVAL_M01" (
  "IDENT"          TEXT       NOT NULL DEFAULT '',
  "NUMERO"         TEXT       NOT NULL DEFAULT '',
  "NUMCP"          TEXT       NOT NULL DEFAULT '',
  "LIBEC"          TEXT       NOT NULL DEFAULT '',
  "COTVA"          TEXT       NOT NULL DEFAULT '',
  "TXTVA"          RATE REAL  NOT NULL DEFAULT 0,
  "HT"             MONEY TEXT NOT NULL DEFAULT '0',
  "TVA"            MONEY TEXT NOT NULL DEFAULT '0',
  "TTC"            MONEY TEXT NOT NULL DEFAULT '0',
  "CPOST"          TEXT       NOT NULL DEFAULT '',
  "CCRIT"          TEXT       NOT NULL DEFAULT '',
  "SENS_DC"        TEXT       NOT NULL DEFAULT '',
  "MTDEBS"         MONEY TEXT NOT NULL DEFAULT '0',
  "MTCRES"         MONEY TEXT NOT NULL DEFAULT '0',
  "MOUVE_UNIQ"     INTEGER    NOT NULL DEFAULT 0,
  PRIMARY KEY ("IDENT")
);

-- Analytic rows of the document being entered.
CREATE TABLE "MIRVAANA_M01" (
  "IDENT"          TEXT       NOT NULL DEFAULT '',
  "NUMERO"         TEXT       NOT NULL DEFAULT '',
  "CSECT"          TEXT       NOT NULL DEFAULT '',
  "MTADE"          MONEY TEXT NOT NULL DEFAULT '0',
  "MTACR"          MONEY TEXT NOT NULL DEFAULT '0',
  PRIMARY KEY ("NUMERO", "IDENT")
);

-- Justification rows of the document being entered.
CREATE TABLE "MIRVAJUS_M01" (
  "IDENTR"         TEXT       NOT NULL DEFAULT '',
  "NUSYS"          INTEGER    NOT NULL DEFAULT 0,
  "MTREG"          MONEY TEXT NOT NULL DEFAULT '0',
  "MTREGS"         MONEY TEXT NOT NULL DEFAULT '0',
  "MTEEUR"         MONEY TEXT NOT NULL DEFAULT '0',
  "MTECHG"         MONEY TEXT NOT NULL DEFAULT '0',
  PRIMARY KEY ("IDENTR", "NUSYS")
);

-- Due dates listed by the justification screen, one row per due date.
CREATE TABLE "MIRVAJUS_M02" (
  "NUSYS"          INTEGER    NOT NULL DEFAULT 0,
  "UNIQ"           INTEGER    NOT NULL DEFAULT 0,   -- movement carrying the due date
  "DTECH"          DATE TEXT  NOT NULL DEFAULT '',
  "DTOPE"          DATE TEXT  NOT NULL DEFAULT '',
  "NPIES"          TEXT       NOT NULL DEFAULT '',  -- first 11 characters of MOUVE.NLIGS
  "NPIEC"          TEXT       NOT NULL DEFAULT '',
  "MTREG"          MONEY TEXT NOT NULL DEFAULT '0',
  "MTREGS"         MONEY TEXT NOT NULL DEFAULT '0',
  "MTEEUR"         MONEY TEXT NOT NULL DEFAULT '0',
  "MTECHG"         MONEY TEXT NOT NULL DEFAULT '0',
  "FLAG_CHG"       TEXT       NOT NULL DEFAULT '',  -- "O" when an exchange difference applies
  PRIMARY KEY ("NUSYS")
);
CREATE INDEX "MIRVAJUS_M02_INDX1" ON "MIRVAJUS_M02" ("DTECH", "NUSYS");

-- Year-months of the dossier, 'YYYYMM', as the accounting library lists them.
CREATE TABLE "MEM02" (
  "ANMOI"          TEXT       NOT NULL DEFAULT ''
);

-- Rows of the period choice of the access screens, in the order they are written.
CREATE TABLE "MEM04" (
  "ANMOI"          TEXT       NOT NULL DEFAULT '',
  "EXERCICE"       TEXT       NOT NULL DEFAULT '',  -- "N" or "N+1"
  "MOIAN"          TEXT       NOT NULL DEFAULT ''   -- 'MM/YYYY' or ' Exercice N', ' Exercice N+1'
);

------------------------------------------------------------------------------------------
-- Reference tables of the accounting application.
------------------------------------------------------------------------------------------

-- Dossier parameters: the row whose PNUME is 1.
CREATE TABLE "PARAM" (
  "PNUME"             INTEGER    NOT NULL DEFAULT 0,
  "MONNAIE_IDENT"     TEXT       NOT NULL DEFAULT '',  -- keeping currency
  "MONNAIE_CMP_IDENT" TEXT       NOT NULL DEFAULT '',  -- accounting currency
  "PDDEX"             DATE TEXT  NOT NULL DEFAULT '',  -- first day of the current exercise
  "PDFEX"             DATE TEXT  NOT NULL DEFAULT '',  -- last day of the current exercise
  "PDTCL"             DATE TEXT  NOT NULL DEFAULT '',  -- last operation date open to entry
  "PXCLO"             TEXT       NOT NULL DEFAULT '',  -- "N" open, "C" closed but reopenable, "O" closed
  "PRE18"             TEXT       NOT NULL DEFAULT '',  -- "O": simplified operations in use
  "PRE19"             TEXT       NOT NULL DEFAULT '',  -- "1": bank and cash lines on expense/revenue accounts
  "PFO13"             TEXT       NOT NULL DEFAULT '',  -- "O": bank and cash lines justify due dates
  "PMTVA"             TEXT       NOT NULL DEFAULT '',  -- VAT due on "D" debits, "E" receipts, else by account
  "PCECC"             TEXT       NOT NULL DEFAULT '',  -- account for exchange losses
  "PCECP"             TEXT       NOT NULL DEFAULT '',  -- account for exchange gains
  "PCEEC"             TEXT       NOT NULL DEFAULT '',  -- account for rounding losses
  "PCEEP"             TEXT       NOT NULL DEFAULT '',  -- account for rounding gains
  "PJOCHAN"           TEXT       NOT NULL DEFAULT '',  -- journal of exchange differences
  "PJOEURO"           TEXT       NOT NULL DEFAULT '',  -- journal of rounding differences
  -- Dossier options, 0 off or 1 on, in the order the option procedure hands them out.
  "OPT_TVA"           INTEGER    NOT NULL DEFAULT 0,   -- VAT
  "OPT_TVA1"          INTEGER    NOT NULL DEFAULT 0,   -- VAT on debits or receipts
  "OPT_QTE"           INTEGER    NOT NULL DEFAULT 0,   -- quantities
  "OPT_QTE1"          INTEGER    NOT NULL DEFAULT 0,
  "OPT_QTE2"          INTEGER    NOT NULL DEFAULT 0,
  "OPT_ANA"           INTEGER    NOT NULL DEFAULT 0,   -- analytics
  "OPT_ANA1"          INTEGER    NOT NULL DEFAULT 0,   -- analytics on every account nature
  "OPT_ANA2"          INTEGER    NOT NULL DEFAULT 0,   -- analytic posts
  "OPT_ECHCLI"        INTEGER    NOT NULL DEFAULT 0,   -- client due dates
  "OPT_ECHFOU"        INTEGER    NOT NULL DEFAULT 0,   -- supplier due dates
  "OPT_ECHAUT"        INTEGER    NOT NULL DEFAULT 0,   -- other tiers' due dates
  "OPT_ECH"           INTEGER    NOT NULL DEFAULT 0,   -- due dates
  "OPT_DEVISE"        INTEGER    NOT NULL DEFAULT 0,   -- foreign currencies
  "OPT_REGT"          INTEGER    NOT NULL DEFAULT 0,   -- settlements
  PRIMARY KEY ("PNUME")
);

-- Chart of accounts. NATUC is a string of nature letters: "C" client, "F" supplier,
-- "A" staff, "B" bank, "I" cash, "P" revenue, "H" expense, "M" fixed asset, "T" VAT
-- account, "U" lines carry VAT, "Q" open to analytics, "R"/"S" bills receivable/payable.
CREATE TABLE "COMPT" (
  "NUMCP"          TEXT       NOT NULL DEFAULT '',
  "LIBCP"          TEXT       NOT NULL DEFAULT '',  -- short title, unique: screens read an account by it
  "NATUC"          TEXT       NOT NULL DEFAULT '',
  "CCTRA"          TEXT       NOT NULL DEFAULT '',  -- "O": left out of the lists
  "COTVA"          TEXT       NOT NULL DEFAULT '',  -- default VAT code
  "CPOST"          TEXT       NOT NULL DEFAULT '',  -- default analytic post
  "CCRIT"          TEXT       NOT NULL DEFAULT '',  -- default distribution key
  "CSECT"          TEXT       NOT NULL DEFAULT '',  -- default analytic section
  "SAANA"          TEXT       NOT NULL DEFAULT '',  -- "O": analytic breakdown mandatory
  "TPTVA"          TEXT       NOT NULL DEFAULT '',  -- VAT due basis of the account: "D" debits, "E" receipts
  "CTYPR"          TEXT       NOT NULL DEFAULT '',  -- payment terms of a tiers
  "JLTRT"          TEXT       NOT NULL DEFAULT '',  -- settlement journal of a tiers
  "CTYEC"          TEXT       NOT NULL DEFAULT '',  -- due-date type of a tiers
  "RGPAY"          TEXT       NOT NULL DEFAULT '',  -- payment method of a tiers
  "ADRE1"          TEXT       NOT NULL DEFAULT '',
  "ADRE2"          TEXT       NOT NULL DEFAULT '',
  "CPOCP"          TEXT       NOT NULL DEFAULT '',  -- postcode
  "VILCP"          TEXT       NOT NULL DEFAULT '',  -- town
  PRIMARY KEY ("NUMCP")
);
CREATE INDEX "COMPT_LIBCP" ON "COMPT" ("LIBCP");

-- Journals. TYPJL: "V" sales, "A" purchases, "T" treasury, "O" miscellaneous.
CREATE TABLE "JONAL" (
  "NUMJL"          TEXT       NOT NULL DEFAULT '',
  "LIBELLE"        TEXT       NOT NULL DEFAULT '',
  "TYPJL"          TEXT       NOT NULL DEFAULT '',
  "NUMEROPI"       TEXT       NOT NULL DEFAULT '',  -- "A": pieces numbered automatically
  "PREFIXPI"       TEXT       NOT NULL DEFAULT '',  -- pattern of the piece number prefix
  "PREFIXIN"       TEXT       NOT NULL DEFAULT '',  -- pattern of the piece label prefix
  "RAZPI"          TEXT       NOT NULL DEFAULT '',  -- "O": numbering restarts every month
  "CLOAM"          TEXT       NOT NULL DEFAULT '',  -- last closed year-month 'YYYYMM', '' when none
  "CPTRE"          TEXT       NOT NULL DEFAULT '',  -- account of a treasury journal
  "MONNAIE_IDENT"  TEXT       NOT NULL DEFAULT '',
  PRIMARY KEY ("NUMJL")
);

-- VAT codes. The rate in force at a date is in HISTVA.
CREATE TABLE "CDTVA" (
  "COTVA"          TEXT       NOT NULL DEFAULT '',
  "LIBELLE"        TEXT       NOT NULL DEFAULT '',
  "TYTVA"          TEXT       NOT NULL DEFAULT '',  -- "V" sales, "A" purchases
  "CITVA"          TEXT       NOT NULL DEFAULT '',  -- VAT account, due on debits
  "CETVA"          TEXT       NOT NULL DEFAULT '',  -- VAT account, due on receipts
  "DETVA"          TEXT       NOT NULL DEFAULT '',  -- deductible VAT account
  PRIMARY KEY ("COTVA")
);

-- Entry models: header.
CREATE TABLE "MODTE" (
  "CODE"           TEXT       NOT NULL DEFAULT '',  -- up to 11 characters
  "LIBELLE"        TEXT       NOT NULL DEFAULT '',
  "NUMJL"          TEXT       NOT NULL DEFAULT '',
  "NPIEC"          TEXT       NOT NULL DEFAULT '',
  "INPIE"          TEXT       NOT NULL DEFAULT '',
  PRIMARY KEY ("CODE")
);

-- Entry models: lines. NLIGNE is the model code padded with blanks to 11 characters
-- followed by the line number; COL_NUMCP is an account, an account root, or "C"/"T" for
-- the tiers and VAT lines that the entry screens make themselves.
CREATE TABLE "MODLI" (
  "CODE"           TEXT       NOT NULL DEFAULT '',
  "NLIGNE"         TEXT       NOT NULL DEFAULT '',
  "COL_NUMCP"      TEXT       NOT NULL DEFAULT '',
  "COL_LIBEC"      TEXT       NOT NULL DEFAULT '',
  "COL_COTVA"      TEXT       NOT NULL DEFAULT '',
  "COL_MTDEB"      MONEY TEXT NOT NULL DEFAULT '0',
  "COL_MTCRE"      MONEY TEXT NOT NULL DEFAULT '0',
  PRIMARY KEY ("CODE", "NLIGNE")
);

-- Expense types of staff expense notes.
CREATE TABLE "TYPFR" (
  "CTYFR"          TEXT       NOT NULL DEFAULT '',
  "ITYFR"          TEXT       NOT NULL DEFAULT '',
  PRIMARY KEY ("CTYFR")
);

-- Standard labels of bank, cash and miscellaneous operations.
CREATE TABLE "TYPLB" (
  "CTYLB"          TEXT       NOT NULL DEFAULT '',
  "ITYLB"          TEXT       NOT NULL DEFAULT '',
  PRIMARY KEY ("CTYLB")
);

-- Sections of a distribution key; MTVEN is a weight against the key's total.
CREATE TABLE "VENSE" (
  "CCRIT"          TEXT       NOT NULL DEFAULT '',
  "CSECT"          TEXT       NOT NULL DEFAULT '',
  "MTVEN"          RATE REAL  NOT NULL DEFAULT 0,
  PRIMARY KEY ("CCRIT", "CSECT")
);

------------------------------------------------------------------------------------------
-- Ledger: written only by the piece import component and the ledger's own procedures.
------------------------------------------------------------------------------------------

-- Pieces. NPIES is the ledger's piece number (11 characters).
CREATE TABLE "PIECE" (
  "NPIES"          TEXT       NOT NULL DEFAULT '',
  "NINST"          TEXT       NOT NULL DEFAULT '',  -- import instance that made it
  "NPIEC"          TEXT       NOT NULL DEFAULT '',  -- the piece's own number
  "NIPIE"          INTEGER    NOT NULL DEFAULT 0,   -- internal piece sequence
  "NUMJL"          TEXT       NOT NULL DEFAULT '',
  "DTOPE"          DATE TEXT  NOT NULL DEFAULT '',
  "DTPIE"          DATE TEXT  NOT NULL DEFAULT '',
  "INPIE"          TEXT       NOT NULL DEFAULT '',  -- label as imported
  "LIBPI"          TEXT       NOT NULL DEFAULT '',  -- label as the ledger shows it
  "NSAIS"          TEXT       NOT NULL DEFAULT '',
  "CORIG"          TEXT       NOT NULL DEFAULT '',  -- origin, '*COMPTA*' for imported pieces
  "MONNAIE_IDENT"  TEXT       NOT NULL DEFAULT '',
  "COURS"          RATE REAL  NOT NULL DEFAULT 0,
  "IMPUT"          TEXT       NOT NULL DEFAULT '',  -- "O": validated for good
  "DTCRE"          DATE TEXT  NOT NULL DEFAULT '',
  PRIMARY KEY ("NPIES")
);

-- Movements. MTDEB/MTCRE are in the keeping currency, MTDEBS/MTCRES in the piece's.
CREATE TABLE "MOUVE" (
  "UNIQ"           INTEGER    NOT NULL DEFAULT 0,
  "NPIES"          TEXT       NOT NULL DEFAULT '',
  "NLIGS"          TEXT       NOT NULL DEFAULT '',  -- NPIES (11 characters) then the line
  "NUMCP"          TEXT       NOT NULL DEFAULT '',
  "NUMJL"          TEXT       NOT NULL DEFAULT '',
  "JLNOR"          TEXT       NOT NULL DEFAULT '',  -- journal of origin of a carried-forward movement
  "DTOPE"          DATE TEXT  NOT NULL DEFAULT '',
  "LIBEC"          TEXT       NOT NULL DEFAULT '',
  "COTVA"          TEXT       NOT NULL DEFAULT '',
  "CPOST"          TEXT       NOT NULL DEFAULT '',
  "CCRIT"          TEXT       NOT NULL DEFAULT '',
  "MONNAIE_IDENT"  TEXT       NOT NULL DEFAULT '',
  "MTDEBS"         MONEY TEXT NOT NULL DEFAULT '0',
  "MTCRES"         MONEY TEXT NOT NULL DEFAULT '0',
  "MTDEB"          MONEY TEXT NOT NULL DEFAULT '0',
  "MTCRE"          MONEY TEXT NOT NULL DEFAULT '0',
  "RELET"          TEXT       NOT NULL DEFAULT '',  -- lettering code, '' when not lettered
  "DTLET"          DATE TEXT  NOT NULL DEFAULT '',  -- day the lettering was made, '' when not lettered
  "RRAPB"          TEXT       NOT NULL DEFAULT '',  -- bank reconciliation mark, '' when not pointed
  "INDX2"          TEXT       NOT NULL DEFAULT '',  -- NUMCP || '|' || date: an account's movements
  PRIMARY KEY ("UNIQ")
);
CREATE INDEX "MOUVE_INDX2" ON "MOUVE" ("INDX2");
CREATE INDEX "MOUVE_NLIGS" ON "MOUVE" ("NLIGS");

-- Analytic rows of the movements, amounts in the piece's currency.
CREATE TABLE "VTSEC" (
  "UNIQ"           INTEGER    NOT NULL DEFAULT 0,
  "MOUVE_UNIQ"     INTEGER    NOT NULL DEFAULT 0,
  "CSECT"          TEXT       NOT NULL DEFAULT '',
  "MTADE"          MONEY TEXT NOT NULL DEFAULT '0',
  "MTACR"          MONEY TEXT NOT NULL DEFAULT '0'
);
CREATE INDEX "VTSEC_MOUVE_UNIQ" ON "VTSEC" ("MOUVE_UNIQ");
-- The row counter reads the largest UNIQ at each draw.
CREATE INDEX "VTSEC_UNIQ" ON "VTSEC" ("UNIQ");

-- Due dates. MTECH is in the keeping currency, MTECHS in the piece's.
CREATE TABLE "ECHEA" (
  "NUSYS"          INTEGER    NOT NULL DEFAULT 0,
  "UNIQ"           INTEGER    NOT NULL DEFAULT 0,   -- movement carrying the due date
  "NPIES"          TEXT       NOT NULL DEFAULT '',
  "INDX1"          TEXT       NOT NULL DEFAULT '',  -- UNIQ as text
  "UNIQR"          INTEGER    NOT NULL DEFAULT 0,   -- settling movement, 0 while open
  "DTECH"          DATE TEXT  NOT NULL DEFAULT '',
  "CTYPR"          TEXT       NOT NULL DEFAULT '',
  "NJLTR"          TEXT       NOT NULL DEFAULT '',  -- settlement journal
  "CTYEC"          TEXT       NOT NULL DEFAULT '',
  "BPECH"          TEXT       NOT NULL DEFAULT '',  -- payment method
  "MTECH"          MONEY TEXT NOT NULL DEFAULT '0',
  "MTECHS"         MONEY TEXT NOT NULL DEFAULT '0',
  "ECART"          MONEY TEXT NOT NULL DEFAULT '0', -- conversion difference
  -- Settlement state, kept up to date by the settlement of bank and cash pieces.
  "MTPAY"          MONEY TEXT NOT NULL DEFAULT '0', -- paid, keeping currency
  "MTPAYS"         MONEY TEXT NOT NULL DEFAULT '0', -- paid, piece currency
  "MTRES"          MONEY TEXT NOT NULL DEFAULT '0', -- still due, keeping currency
  "MTRESS"         MONEY TEXT NOT NULL DEFAULT '0', -- still due, piece currency
  "RELET"          TEXT       NOT NULL DEFAULT '',  -- lettering group of its settlement, '' while open
  "SIECH"          TEXT       NOT NULL DEFAULT '',
  "NUREL"          TEXT       NOT NULL DEFAULT '',
  "DERNL"          TEXT       NOT NULL DEFAULT '',
  "OBECH"          TEXT       NOT NULL DEFAULT '',
  PRIMARY KEY ("NUSYS")
);
CREATE INDEX "ECHEA_INDX1" ON "ECHEA" ("INDX1");
CREATE INDEX "ECHEA_UNIQ" ON "ECHEA" ("UNIQ");

------------------------------------------------------------------------------------------
-- Transfer tables towards the piece import component: rows tagged with their import
-- instance NINST, in the order they were written.
------------------------------------------------------------------------------------------

CREATE TABLE "PIECE_IMM" (
  "NINST"          TEXT       NOT NULL DEFAULT '',
  "NUMJL"          TEXT       NOT NULL DEFAULT '',
  "DTOPE"          DATE TEXT  NOT NULL DEFAULT '',
  "NSAIS"          TEXT       NOT NULL DEFAULT '',
  "NPIEC"          TEXT       NOT NULL DEFAULT '',
  "INPIE"          TEXT       NOT NULL DEFAULT '',
  "MONNAIE_IDENT"  TEXT       NOT NULL DEFAULT '',
  "COURS"          RATE REAL  NOT NULL DEFAULT 0,
  "CORIG"          TEXT       NOT NULL DEFAULT ''
);

CREATE TABLE "MOUVE_IMM" (
  "NINST"          TEXT       NOT NULL DEFAULT '',
  "NUMCP"          TEXT       NOT NULL DEFAULT '',
  "LIBEC"          TEXT       NOT NULL DEFAULT '',
  "MTCRE"          MONEY TEXT NOT NULL DEFAULT '0',
  "MTDEB"          MONEY TEXT NOT NULL DEFAULT '0',
  "COTVA"          TEXT       NOT NULL DEFAULT '',
  "CPOST"          TEXT       NOT NULL DEFAULT '',
  "CCRIT"          TEXT       NOT NULL DEFAULT ''
);

CREATE TABLE "ECHEA_IMM" (
  "NINST"          TEXT       NOT NULL DEFAULT '',
  "DTECH"          DATE TEXT  NOT NULL DEFAULT '',
  "CTYPR"          TEXT       NOT NULL DEFAULT '',
  "NJLTR"          TEXT       NOT NULL DEFAULT '',
  "CTYEC"          TEXT       NOT NULL DEFAULT '',
  "MTECH"          MONEY TEXT NOT NULL DEFAULT '0',
  "BPECH"          TEXT       NOT NULL DEFAULT ''
);

CREATE TABLE "VTSEC_IMM" (
  "NINST"          TEXT       NOT NULL DEFAULT '',
  "CSECT"          TEXT       NOT NULL DEFAULT '',
  "MTADE"          MONEY TEXT NOT NULL DEFAULT '0',
  "MTACR"          MONEY TEXT NOT NULL DEFAULT '0'
);

-- Rounding and exchange differences gathered by the settlement of bank and cash pieces.
CREATE TABLE "EAEUR" (
  "NINST"          TEXT       NOT NULL DEFAULT '',
  "NUMJL"          TEXT       NOT NULL DEFAULT '',
  "NPIEC"          TEXT       NOT NULL DEFAULT '',
  "NPICPTA"        TEXT       NOT NULL DEFAULT '',  -- ledger piece settled
  "NIPIE"          INTEGER    NOT NULL DEFAULT 0,
  "NUMCP"          TEXT       NOT NULL DEFAULT '',
  "LIBECR"         TEXT       NOT NULL DEFAULT '',
  "MONTANT"        MONEY TEXT NOT NULL DEFAULT '0',
  "SENS"           TEXT       NOT NULL DEFAULT '',  -- "D" or "C"
  "NUMENG"         INTEGER    NOT NULL DEFAULT 0
);

------------------------------------------------------------------------------------------
-- Tables of the accounting application's own services.
------------------------------------------------------------------------------------------

-- Piece counters of the journals. CLE is "N", "N+1" or a year-month 'YYYYMM' for a
-- journal whose numbering restarts every month; NUMERO is the last number given.
CREATE TABLE "NUMPI" (
  "NUMJL"          TEXT       NOT NULL DEFAULT '',
  "CLE"            TEXT       NOT NULL DEFAULT '',
  "NUMERO"         INTEGER    NOT NULL DEFAULT 0,
  PRIMARY KEY ("NUMJL", "CLE")
);

-- VAT rate history: the rate of a code holds from DTDEB until the next row's DTDEB.
CREATE TABLE "HISTVA" (
  "COTVA"          TEXT       NOT NULL DEFAULT '',
  "DTDEB"          DATE TEXT  NOT NULL DEFAULT '',
  "TXTVA"          RATE REAL  NOT NULL DEFAULT 0,
  PRIMARY KEY ("COTVA", "DTDEB")
);

-- Currencies. ZONE_EURO "O" for a currency tied to the euro; COURS_FIXE is its fixed
-- parity (units per euro), 0 for a floating currency.
CREATE TABLE "MONNAIE" (
  "IDENT"          TEXT       NOT NULL DEFAULT '',
  "LIBELLE"        TEXT       NOT NULL DEFAULT '',
  "DECIMALES"      INTEGER    NOT NULL DEFAULT 0,
  "ZONE_EURO"      TEXT       NOT NULL DEFAULT '',
  "COURS_FIXE"     RATE REAL  NOT NULL DEFAULT 0,
  PRIMARY KEY ("IDENT")
);

-- Exchange rates of the floating currencies, units of the currency per euro, holding
-- from DTCOURS until the next row's DTCOURS.
CREATE TABLE "MONNAIE_COURS" (
  "IDENT"          TEXT       NOT NULL DEFAULT '',
  "DTCOURS"        DATE TEXT  NOT NULL DEFAULT '',
  "COURS"          RATE REAL  NOT NULL DEFAULT 0,
  PRIMARY KEY ("IDENT", "DTCOURS")
);

-- Document-number counters: DERNIER is the last number given for NOM.
CREATE TABLE "NDOC" (
  "NOM"            TEXT       NOT NULL DEFAULT '',
  "DERNIER"        INTEGER    NOT NULL DEFAULT 0,
  PRIMARY KEY ("NOM")
);

-- Label tables: LIBE1 overrides LIBEL code by code.
CREATE TABLE "LIBE1" (
  "CODE"           TEXT       NOT NULL DEFAULT '',
  "TEXTE"          TEXT       NOT NULL DEFAULT '',
  PRIMARY KEY ("CODE")
);

CREATE TABLE "LIBEL" (
  "CODE"           TEXT       NOT NULL DEFAULT '',
  "TEXTE"          TEXT       NOT NULL DEFAULT '',
  PRIMARY KEY ("CODE")
);

-- Analytic posts.
CREATE TABLE "POANA" (
  "IDENT"          TEXT       NOT NULL DEFAULT '',
  "LPOST"          TEXT       NOT NULL DEFAULT '',
  PRIMARY KEY ("IDENT")
);

-- Distribution keys; their sections and shares are in VENSE.
CREATE TABLE "CRITA" (
  "IDENT"          TEXT       NOT NULL DEFAULT '',
  "LCRIT"          TEXT       NOT NULL DEFAULT '',
  PRIMARY KEY ("IDENT")
);

-- Analytic sections. SCLOT "O" closed; CLOAN "O" lets entries through whatever the
-- closing state and the dates.
CREATE TABLE "SECAN" (
  "CSECT"          TEXT       NOT NULL DEFAULT '',
  "LSECT"          TEXT       NOT NULL DEFAULT '',
  "SCLOT"          TEXT       NOT NULL DEFAULT '',
  "CLOAN"          TEXT       NOT NULL DEFAULT '',
  "DTOUV"          DATE TEXT  NOT NULL DEFAULT '',
  "DTCLO"          DATE TEXT  NOT NULL DEFAULT '',
  PRIMARY KEY ("CSECT")
);

-- Records read by the reading procedures of the accounting modules: each holds the
-- record last read, with the columns of the table it was read from.
CREATE TABLE "I_MONNAIE" (
  "IDENT"          TEXT       NOT NULL DEFAULT '',
  "LIBELLE"        TEXT       NOT NULL DEFAULT '',
  "DECIMALES"      INTEGER    NOT NULL DEFAULT 0,
  "ZONE_EURO"      TEXT       NOT NULL DEFAULT '',
  "COURS_FIXE"     RATE REAL  NOT NULL DEFAULT 0
);

CREATE TABLE "I_CPCOMPT" (
  "NUMCP"          TEXT       NOT NULL DEFAULT '',
  "LIBCP"          TEXT       NOT NULL DEFAULT '',
  "NATUC"          TEXT       NOT NULL DEFAULT '',
  "CCTRA"          TEXT       NOT NULL DEFAULT '',
  "COTVA"          TEXT       NOT NULL DEFAULT '',
  "CPOST"          TEXT       NOT NULL DEFAULT '',
  "CCRIT"          TEXT       NOT NULL DEFAULT '',
  "CSECT"          TEXT       NOT NULL DEFAULT '',
  "SAANA"          TEXT       NOT NULL DEFAULT '',
  "TPTVA"          TEXT       NOT NULL DEFAULT '',
  "CTYPR"          TEXT       NOT NULL DEFAULT '',
  "JLTRT"          TEXT       NOT NULL DEFAULT '',
  "CTYEC"          TEXT       NOT NULL DEFAULT '',
  "RGPAY"          TEXT       NOT NULL DEFAULT '',
  "ADRE1"          TEXT       NOT NULL DEFAULT '',
  "ADRE2"          TEXT       NOT NULL DEFAULT '',
  "CPOCP"          TEXT       NOT NULL DEFAULT '',
  "VILCP"          TEXT       NOT NULL DEFAULT ''
);

CREATE TABLE "I_CPSECAN" (
  "CSECT"          TEXT       NOT NULL DEFAULT '',
  "LSECT"          TEXT       NOT NULL DEFAULT '',
  "SCLOT"          TEXT       NOT NULL DEFAULT '',
  "CLOAN"          TEXT       NOT NULL DEFAULT '',
  "DTOUV"          DATE TEXT  NOT NULL DEFAULT '',
  "DTCLO"          DATE TEXT  NOT NULL DEFAULT ''
);

CREATE TABLE "I_CPPOANA" (
  "IDENT"          TEXT       NOT NULL DEFAULT '',
  "LPOST"          TEXT       NOT NULL DEFAULT ''
);

CREATE TABLE "I_CPCRITA" (
  "IDENT"          TEXT       NOT NULL DEFAULT '',
  "LCRIT"          TEXT       NOT NULL DEFAULT ''
);

-- Error texts of a piece import, in the order the import component reports them.
CREATE TABLE "IMPORT_ERREUR" (
  "NINST"          TEXT       NOT NULL DEFAULT '',
  "ORDRE"          INTEGER    NOT NULL DEFAULT 0,
  "CODE"           INTEGER    NOT NULL DEFAULT 0,
  "TEXTE"          TEXT       NOT NULL DEFAULT '',
  PRIMARY KEY ("NINST", "ORDRE")
);

-- Import instances of the piece import component.
CREATE TABLE "IMPORT_INSTANCE" (
  "NINST"          TEXT       NOT NULL DEFAULT '',
  "ETAT"           TEXT       NOT NULL DEFAULT '',
  "DTCRE"          DATE TEXT  NOT NULL DEFAULT '',
  PRIMARY KEY ("NINST")
);

-- Pieces reserved for deletion, and by whom.
CREATE TABLE "PIECE_RESERVEE" (
  "NPIES"          TEXT       NOT NULL DEFAULT '',
  "PROPRIETAIRE"   TEXT       NOT NULL DEFAULT '',
  "DTRES"          TEXT       NOT NULL DEFAULT '',
  PRIMARY KEY ("NPIES")
);

-- Facts about the dossier file itself.
CREATE TABLE "DOSSIER_INFO" (
  "CLE"            TEXT       NOT NULL DEFAULT '',
  "VALEUR"         TEXT       NOT NULL DEFAULT '',
  PRIMARY KEY ("CLE")
);

INSERT INTO "DOSSIER_INFO" ("CLE", "VALEUR") VALUES ('schema_version', '2');
