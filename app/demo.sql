-- Demo dossier: Atelier Castagnède SARL, a cabinet-making workshop near Périgueux that
-- sells furniture, fits it on site and renovates interiors.
--
-- Reference data only: the operations are entered through the screens. {{PDDEX}},
-- {{PDFEX}} and {{PDTCL}} are replaced with ISO dates when the dossier is made, so that
-- the current exercise holds the day the dossier was made.

INSERT OR REPLACE INTO "DOSSIER_INFO" ("CLE", "VALEUR") VALUES
  ('company_name', 'Atelier Castagnède SARL');

-- Dossier parameters ------------------------------------------------------------------

INSERT INTO "PARAM" (
  "PNUME", "MONNAIE_IDENT", "MONNAIE_CMP_IDENT", "PDDEX", "PDFEX", "PDTCL",
  "PXCLO", "PRE18", "PRE19", "PFO13", "PMTVA",
  "PCECC", "PCECP", "PCEEC", "PCEEP", "PJOCHAN", "PJOEURO",
  "OPT_TVA", "OPT_TVA1", "OPT_QTE", "OPT_QTE1", "OPT_QTE2",
  "OPT_ANA", "OPT_ANA1", "OPT_ANA2",
  "OPT_ECHCLI", "OPT_ECHFOU", "OPT_ECHAUT", "OPT_ECH",
  "OPT_DEVISE", "OPT_REGT")
VALUES (
  1, 'EUR', 'EUR', '{{PDDEX}}', '{{PDFEX}}', '{{PDTCL}}',
  'N', 'O', '', 'O', '',
  '666000', '766000', '658000', '758000', 'ODC', 'ODE',
  1, 0, 0, 0, 0,
  1, 0, 0,
  1, 1, 0, 1,
  1, 0);

-- Currencies ----------------------------------------------------------------------------

INSERT INTO "MONNAIE" ("IDENT", "LIBELLE", "DECIMALES", "ZONE_EURO", "COURS_FIXE") VALUES
  ('EUR', 'Euro',              2, 'O', 0),
  ('FRF', 'Franc français',    2, 'O', 6.55957),
  ('USD', 'Dollar américain',  2, 'N', 0),
  ('JPY', 'Yen japonais',      0, 'N', 0),
  ('XPF', 'Franc CFP',         0, 'N', 119.331742);

-- Units of the currency for one euro.
INSERT INTO "MONNAIE_COURS" ("IDENT", "DTCOURS", "COURS") VALUES
  ('USD', '2013-01-01', 1.3194), ('USD', '2013-07-01', 1.3080),
  ('USD', '2014-01-01', 1.3791), ('USD', '2014-07-01', 1.3658),
  ('USD', '2015-01-01', 1.2141), ('USD', '2015-07-01', 1.1189),
  ('USD', '2016-01-01', 1.0887), ('USD', '2016-07-01', 1.1102),
  ('USD', '2017-01-01', 1.0541), ('USD', '2017-07-01', 1.1412),
  ('USD', '2018-01-01', 1.1993), ('USD', '2018-07-01', 1.1658),
  ('USD', '2019-01-01', 1.1450), ('USD', '2019-07-01', 1.1370),
  ('USD', '2020-01-01', 1.1234), ('USD', '2020-07-01', 1.1219),
  ('USD', '2021-01-01', 1.2271), ('USD', '2021-07-01', 1.1884),
  ('USD', '2022-01-01', 1.1326), ('USD', '2022-07-01', 1.0387),
  ('USD', '2023-01-01', 1.0666), ('USD', '2023-07-01', 1.0866),
  ('USD', '2024-01-01', 1.1050), ('USD', '2024-07-01', 1.0705),
  ('USD', '2025-01-01', 1.0389), ('USD', '2025-04-01', 1.0796),
  ('USD', '2025-07-01', 1.1720), ('USD', '2025-10-01', 1.1741),
  ('USD', '2026-01-01', 1.1720), ('USD', '2026-04-01', 1.1534),
  ('USD', '2026-07-01', 1.1608), ('USD', '2026-10-01', 1.1655),
  ('USD', '2027-01-01', 1.1690), ('USD', '2027-04-01', 1.1725),
  ('USD', '2027-07-01', 1.1680), ('USD', '2027-10-01', 1.1712),
  ('JPY', '2013-01-01', 113.61), ('JPY', '2013-07-01', 129.39),
  ('JPY', '2014-01-01', 144.72), ('JPY', '2014-07-01', 138.44),
  ('JPY', '2015-01-01', 145.23), ('JPY', '2015-07-01', 137.01),
  ('JPY', '2016-01-01', 131.07), ('JPY', '2016-07-01', 114.05),
  ('JPY', '2017-01-01', 123.40), ('JPY', '2017-07-01', 127.75),
  ('JPY', '2018-01-01', 135.01), ('JPY', '2018-07-01', 129.04),
  ('JPY', '2019-01-01', 125.85), ('JPY', '2019-07-01', 122.60),
  ('JPY', '2020-01-01', 121.94), ('JPY', '2020-07-01', 121.11),
  ('JPY', '2021-01-01', 126.18), ('JPY', '2021-07-01', 131.62),
  ('JPY', '2022-01-01', 130.38), ('JPY', '2022-07-01', 141.54),
  ('JPY', '2023-01-01', 140.66), ('JPY', '2023-07-01', 157.16),
  ('JPY', '2024-01-01', 156.33), ('JPY', '2024-07-01', 173.10),
  ('JPY', '2025-01-01', 163.06), ('JPY', '2025-04-01', 161.46),
  ('JPY', '2025-07-01', 169.17), ('JPY', '2025-10-01', 172.35),
  ('JPY', '2026-01-01', 175.20), ('JPY', '2026-04-01', 171.85),
  ('JPY', '2026-07-01', 168.40), ('JPY', '2026-10-01', 170.95),
  ('JPY', '2027-01-01', 172.30), ('JPY', '2027-04-01', 169.80),
  ('JPY', '2027-07-01', 167.25), ('JPY', '2027-10-01', 168.90);

-- VAT -----------------------------------------------------------------------------------

-- Sales VAT is due on receipts for services and on debits for goods: CITVA serves the
-- latter, CETVA the former (the revenue accounts say which through TPTVA).
INSERT INTO "CDTVA" ("COTVA", "LIBELLE", "TYTVA", "CITVA", "CETVA", "DETVA") VALUES
  ('V20', 'TVA collectée taux normal',         'V', '445711', '445800', '445660'),
  ('V10', 'TVA collectée taux intermédiaire',  'V', '445713', '445800', '445660'),
  ('V55', 'TVA collectée taux réduit',         'V', '445712', '445800', '445660'),
  ('A20', 'TVA déductible taux normal',        'A', '445660', '445660', '445660'),
  ('A10', 'TVA déductible taux intermédiaire', 'A', '445660', '445660', '445660'),
  ('A55', 'TVA déductible taux réduit',        'A', '445660', '445660', '445660');

INSERT INTO "HISTVA" ("COTVA", "DTDEB", "TXTVA") VALUES
  ('V20', '1990-01-01', 19.6), ('V20', '2014-01-01', 20),
  ('A20', '1990-01-01', 19.6), ('A20', '2014-01-01', 20),
  ('V10', '2014-01-01', 10),   ('A10', '2014-01-01', 10),
  ('V55', '1990-01-01', 5.5),  ('A55', '1990-01-01', 5.5);

-- Analytics -----------------------------------------------------------------------------

INSERT INTO "POANA" ("IDENT", "LPOST") VALUES
  ('PROD',   'Production'),
  ('STRUCT', 'Structure');

INSERT INTO "CRITA" ("IDENT", "LCRIT") VALUES
  ('ATEL', 'Atelier 60 % / chantiers 40 %'),
  ('EGAL', 'Parts égales atelier, chantiers, administration');

INSERT INTO "SECAN" ("CSECT", "LSECT", "SCLOT", "CLOAN", "DTOUV", "DTCLO") VALUES
  ('ADMIN',    'Administration',           'N', 'N', '2010-01-01', ''),
  ('ATELIER',  'Atelier de fabrication',   'N', 'N', '2010-01-01', ''),
  ('CHANTIER', 'Chantiers de pose',        'N', 'N', '2010-01-01', ''),
  ('SALON19',  'Salon de l''habitat 2019', 'O', 'N', '2019-01-01', '2019-12-31');

INSERT INTO "VENSE" ("CCRIT", "CSECT", "MTVEN") VALUES
  ('ATEL', 'ATELIER',  60),
  ('ATEL', 'CHANTIER', 40),
  ('EGAL', 'ADMIN',    1),
  ('EGAL', 'ATELIER',  1),
  ('EGAL', 'CHANTIER', 1);

-- Chart of accounts ---------------------------------------------------------------------

-- Clients. 411900 is an old account kept for history, left out of the lists.
INSERT INTO "COMPT" ("NUMCP", "LIBCP", "NATUC", "CCTRA", "CTYPR", "JLTRT", "CTYEC", "RGPAY",
                     "ADRE1", "ADRE2", "CPOCP", "VILCP") VALUES
  ('411001', 'Brasserie Lissandre',     'C', '',  '30FM',  'BQ1', 'FACT', 'VIR',
   '12 rue des Tanneurs', '', '24000', 'PÉRIGUEUX'),
  ('411002', 'SCI Berthomieu',          'C', '',  '45FM',  'BQ1', 'LCR',  'LCR',
   'Domaine de la Peyrière', 'Route de Brantôme', '24350', 'TOCANE-SAINT-APRE'),
  ('411003', 'Cabinet Vaillergues',     'C', '',  '30J',   'BQ2', 'FACT', 'CHQ',
   '4 place du Marché', '', '24100', 'BERGERAC'),
  ('411004', 'Carrère Julien',          'C', '',  'COMPT', 'CA',  'FACT', 'ESP',
   'Lieu-dit Les Granges', '', '24330', 'SAINT-PIERRE-DE-CHIGNAC'),
  ('411005', 'Gîtes du Moulin Bas',     'C', '',  '30FM',  'BQ1', 'FACT', 'VIR',
   'Le Moulin Bas', 'Chemin de la Beune', '24620', 'LES EYZIES'),
  ('411006', 'Hartwell Interiors Inc.', 'C', '',  '60J',   'BQ1', 'FACT', 'VIR',
   '1184 Larkspur Avenue', 'Suite 300', '97205', 'PORTLAND, OR (USA)'),
  ('411900', 'Ancien client Dufaure',   'C', 'O', '',      '',    '',     '',
   '8 impasse des Charmes', '', '24750', 'TRÉLISSAC');

-- Suppliers.
INSERT INTO "COMPT" ("NUMCP", "LIBCP", "NATUC", "CCTRA", "CTYPR", "JLTRT", "CTYEC", "RGPAY",
                     "ADRE1", "ADRE2", "CPOCP", "VILCP") VALUES
  ('401001', 'Scierie Maurel Frères',   'F', '', '30FM', 'BQ1', 'FACT', 'VIR',
   'Zone artisanale du Bos', '', '24260', 'LE BUGUE'),
  ('401002', 'Quincaillerie Delpeyrat', 'F', '', '30J',  'BQ1', 'FACT', 'CHQ',
   '27 avenue de Limoges', '', '24000', 'PÉRIGUEUX'),
  ('401003', 'Vernis et Teintes Arnal', 'F', '', '45FM', 'BQ1', 'LCR',  'LCR',
   '3 rue de l''Industrie', 'BP 112', '33130', 'BÈGLES'),
  ('401004', 'Transports Lagarrigue',   'F', '', '30FM', 'BQ1', 'FACT', 'PRE',
   'Route de Bordeaux', '', '24400', 'MUSSIDAN');

-- Staff.
INSERT INTO "COMPT" ("NUMCP", "LIBCP", "NATUC", "CCTRA", "CTYPR", "JLTRT", "CTYEC", "RGPAY",
                     "ADRE1", "ADRE2", "CPOCP", "VILCP") VALUES
  ('421001', 'Bonnefon Lucas', 'A', '', '', 'BQ1', 'FACT', 'VIR',
   '5 rue Gambetta', '', '24000', 'PÉRIGUEUX'),
  ('421002', 'Roques Émilie',  'A', '', '', 'BQ1', 'FACT', 'VIR',
   '19 allée des Platanes', '', '24430', 'MARSAC-SUR-L''ISLE');

-- General accounts. "U": lines on the account carry VAT; "Q": open to analytics. The
-- services (706xxx, TPTVA "E") owe their VAT on receipts, the goods (TPTVA "D") on debits.
INSERT INTO "COMPT" ("NUMCP", "LIBCP", "NATUC", "COTVA", "CPOST", "CCRIT", "CSECT", "SAANA",
                     "TPTVA") VALUES
  ('218300', 'Matériel informatique',             'MU',  'A20', '',       '',     '',         '',  ''),
  ('445660', 'TVA déductible sur ABS',            'T',   '',    '',       '',     '',         '',  ''),
  ('445710', 'TVA collectée',                     'T',   '',    '',       '',     '',         '',  ''),
  ('445711', 'TVA collectée 20 %',                'T',   '',    '',       '',     '',         '',  ''),
  ('445712', 'TVA collectée 5,5 %',               'T',   '',    '',       '',     '',         '',  ''),
  ('445713', 'TVA collectée 10 %',                'T',   '',    '',       '',     '',         '',  ''),
  ('445800', 'TVA collectée sur encaissements',   'T',   '',    '',       '',     '',         '',  ''),
  ('512100', 'Banque compte courant',             'B',   '',    '',       '',     '',         '',  ''),
  ('512200', 'Banque compte projets',             'B',   '',    '',       '',     '',         '',  ''),
  ('530000', 'Caisse',                            'I',   '',    '',       '',     '',         '',  ''),
  ('601000', 'Achats bois et panneaux',           'HQU', 'A20', 'PROD',   'ATEL', '',         'N', ''),
  ('602200', 'Quincaillerie et visserie',         'HQU', 'A20', 'PROD',   '',     'ATELIER',  'O', ''),
  ('606100', 'Électricité',                       'HU',  'A20', '',       '',     '',         '',  ''),
  ('606400', 'Fournitures administratives',       'HQU', 'A20', 'STRUCT', '',     'ADMIN',    'N', ''),
  ('615500', 'Entretien du matériel',             'HQU', 'A20', 'PROD',   'EGAL', '',         'N', ''),
  ('624100', 'Transports sur achats',             'HU',  'A20', '',       '',     '',         '',  ''),
  ('625100', 'Voyages et déplacements',           'HU',  'A10', '',       '',     '',         '',  ''),
  ('625600', 'Frais de mission',                  'HU',  'A10', '',       '',     '',         '',  ''),
  ('625700', 'Réceptions',                        'HU',  'A10', '',       '',     '',         '',  ''),
  ('626000', 'Frais postaux et télécom.',         'HU',  'A20', '',       '',     '',         '',  ''),
  ('627000', 'Services bancaires',                'H',   '',    '',       '',     '',         '',  ''),
  ('658000', 'Charges diverses de gestion',       'H',   '',    '',       '',     '',         '',  ''),
  ('666000', 'Pertes de change',                  'H',   '',    '',       '',     '',         '',  ''),
  ('706000', 'Prestations de services',           'PQU', 'V20', 'PROD',   'ATEL', '',         'N', 'E'),
  ('706100', 'Prestations de pose',               'PQU', 'V20', 'PROD',   '',     'CHANTIER', 'N', 'E'),
  ('706300', 'Travaux de rénovation',             'PQU', 'V10', 'PROD',   '',     'CHANTIER', 'N', 'E'),
  ('706400', 'Rénovation énergétique',            'PQU', 'V55', 'PROD',   '',     'CHANTIER', 'N', 'E'),
  ('707000', 'Ventes de mobilier',                'PQU', 'V20', 'PROD',   'ATEL', '',         'N', 'D'),
  ('707100', 'Ventes de mobilier export',         'PQ',  '',    'PROD',   'ATEL', '',         'N', ''),
  ('708500', 'Ports et frais facturés',           'PU',  'V20', '',       '',     '',         '',  'D'),
  ('758000', 'Produits divers de gestion',        'P',   '',    '',       '',     '',         '',  ''),
  ('766000', 'Gains de change',                   'P',   '',    '',       '',     '',         '',  '');

-- Journals ------------------------------------------------------------------------------

-- The entry screens propose the first journal of their nature in code order: VT for
-- sales and OD for miscellaneous operations, hence VX, ODC and ODE for the others.
INSERT INTO "JONAL" ("NUMJL", "LIBELLE", "TYPJL", "NUMEROPI", "PREFIXPI", "PREFIXIN", "RAZPI",
                     "CLOAM", "CPTRE", "MONNAIE_IDENT") VALUES
  ('VT',  'Ventes',                                'V', 'A', 'VT', '', 'O', '', '',       'EUR'),
  ('VX',  'Ventes export (numérotation manuelle)', 'V', '',  '',   '', 'N', '', '',       'EUR'),
  ('AC',  'Achats',                                'A', 'A', '',   '', 'N', '', '',       'EUR'),
  ('BQ1', 'Banque compte courant',                 'T', 'A', '',   '', 'N', '', '512100', 'EUR'),
  ('BQ2', 'Banque compte projets',                 'T', 'A', '',   '', 'N', '', '512200', 'EUR'),
  ('CA',  'Caisse',                                'T', 'A', '',   '', 'N', '', '530000', 'EUR'),
  ('OD',  'Opérations diverses',                   'O', 'A', '',   '', 'N', '', '',       'EUR'),
  ('ODC', 'Écarts de change',                      'O', 'A', '',   '', 'N', '', '',       'EUR'),
  ('ODE', 'Écarts d''arrondi',                     'O', 'A', '',   '', 'N', '', '',       'EUR');

-- Entry models --------------------------------------------------------------------------

INSERT INTO "MODTE" ("CODE", "LIBELLE", "NUMJL", "NPIEC", "INPIE") VALUES
  ('VTPOSE',   'Facture de fourniture et pose',  'VT',  '', 'Facture pose n° [PIECE]'),
  ('VXEXPORT', 'Facture export Hartwell',        'VX',  '', 'Facture export n° [PIECE]'),
  ('ACBOIS',   'Achat de bois Maurel',           'AC',  '', 'Facture Scierie Maurel n° [PIECE]'),
  ('BQMAUREL', 'Règlement Scierie Maurel',       'BQ1', '', 'Règlement Scierie Maurel'),
  ('ODCAISSE', 'Approvisionnement de la caisse', 'OD',  '', 'Approvisionnement caisse');

-- NLIGNE: the model code padded to 11 characters, then the line number.
INSERT INTO "MODLI" ("CODE", "NLIGNE", "COL_NUMCP", "COL_LIBEC", "COL_COTVA", "COL_MTDEB", "COL_MTCRE")
VALUES
  ('VTPOSE',   printf('%-11s%03d', 'VTPOSE', 1),   'C',      '',                         '',    '0',   '0'),
  ('VTPOSE',   printf('%-11s%03d', 'VTPOSE', 2),   '706',    'Pose et ajustage',         '',    '0',   '0'),
  ('VTPOSE',   printf('%-11s%03d', 'VTPOSE', 3),   '707000', '',                         'V20', '0',   '0'),
  ('VTPOSE',   printf('%-11s%03d', 'VTPOSE', 4),   'T',      '',                         '',    '0',   '0'),
  ('VXEXPORT', printf('%-11s%03d', 'VXEXPORT', 1), '411006', '',                         '',    '0',   '0'),
  ('VXEXPORT', printf('%-11s%03d', 'VXEXPORT', 2), '7071',   'Mobilier sur mesure',      '',    '0',   '0'),
  ('ACBOIS',   printf('%-11s%03d', 'ACBOIS', 1),   '401001', '',                         '',    '0',   '0'),
  ('ACBOIS',   printf('%-11s%03d', 'ACBOIS', 2),   '601000', 'Bois massif',              'A20', '0',   '0'),
  ('ACBOIS',   printf('%-11s%03d', 'ACBOIS', 3),   '624100', 'Transport',                '',    '0',   '0'),
  ('ACBOIS',   printf('%-11s%03d', 'ACBOIS', 4),   'T',      '',                         '',    '0',   '0'),
  ('BQMAUREL', printf('%-11s%03d', 'BQMAUREL', 1), '401001', 'Règlement facture',        '',    '0',   '0'),
  ('ODCAISSE', printf('%-11s%03d', 'ODCAISSE', 1), '530000', '',                         '',    '150', '0'),
  ('ODCAISSE', printf('%-11s%03d', 'ODCAISSE', 2), '512100', 'Retrait d''espèces',       '',    '0',   '150');

-- Standard texts ------------------------------------------------------------------------

INSERT INTO "TYPFR" ("CTYFR", "ITYFR") VALUES
  ('HOTEL', 'Frais d''hôtel'),
  ('KM',    'Indemnités kilométriques'),
  ('PEAGE', 'Péages et stationnement'),
  ('REPAS', 'Frais de repas'),
  ('FOURN', 'Petites fournitures');

INSERT INTO "TYPLB" ("CTYLB", "ITYLB") VALUES
  ('APPRO',   'Approvisionnement de la caisse'),
  ('FRAISBQ', 'Frais bancaires'),
  ('PRLV',    'Prélèvement'),
  ('REMCHQ',  'Remise de chèques'),
  ('VIRCLI',  'Virement reçu d''un client'),
  ('VIRFOU',  'Virement à un fournisseur');

-- Counters ------------------------------------------------------------------------------

-- Document numbers start from nothing; the journals' piece counters (NUMPI) are made
-- on their first use.
INSERT INTO "NDOC" ("NOM", "DERNIER") VALUES
  ('ECHEA',    0),
  ('MIRVAANA', 0),
  ('MIRVAE',   0),
  ('MIRVAL',   0);
