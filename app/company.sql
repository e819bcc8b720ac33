-- Reference data of a new French company's dossier: the standard chart of accounts
-- (main accounts of a small company, classes 1 to 7), the VAT codes with their rate
-- history, the usual journals and the dossier parameters every entry screen reads.
--
-- `mirvae init --company` runs this text once, in the transaction that makes the
-- dossier. {{COMPANY}} is replaced with the company's name as an SQL literal,
-- {{MONNAIE}} with the keeping currency, {{PDDEX}}, {{PDFEX}} and {{PDTCL}} with ISO
-- dates. Clients, suppliers and staff come later (`mirvae import ... tiers`); the
-- generic accounts 411000, 401000 and 421000 serve until then.

INSERT OR REPLACE INTO "DOSSIER_INFO" ("CLE", "VALEUR") VALUES ('company_name', {{COMPANY}});

-- Dossier parameters ------------------------------------------------------------------

-- Simplified operations on; VAT due as each revenue account says (TPTVA); bank and cash
-- lines on client and supplier accounts, settling their due dates; no analytics until
-- the company sets its sections and turns OPT_ANA on.
INSERT INTO "PARAM" (
  "PNUME", "MONNAIE_IDENT", "MONNAIE_CMP_IDENT", "PDDEX", "PDFEX", "PDTCL",
  "PXCLO", "PRE18", "PRE19", "PFO13", "PMTVA",
  "PCECC", "PCECP", "PCEEC", "PCEEP", "PJOCHAN", "PJOEURO",
  "OPT_TVA", "OPT_TVA1", "OPT_QTE", "OPT_QTE1", "OPT_QTE2",
  "OPT_ANA", "OPT_ANA1", "OPT_ANA2",
  "OPT_ECHCLI", "OPT_ECHFOU", "OPT_ECHAUT", "OPT_ECH",
  "OPT_DEVISE", "OPT_REGT")
VALUES (
  1, '{{MONNAIE}}', '{{MONNAIE}}', '{{PDDEX}}', '{{PDFEX}}', '{{PDTCL}}',
  'N', 'O', '', 'O', '',
  '666000', '766000', '658000', '758000', 'ODC', 'ODE',
  1, 0, 0, 0, 0,
  0, 0, 0,
  1, 1, 0, 1,
  1, 0);

-- Currencies ----------------------------------------------------------------------------

-- Rates of the floating currencies come with `mirvae import ... rates`.
INSERT INTO "MONNAIE" ("IDENT", "LIBELLE", "DECIMALES", "ZONE_EURO", "COURS_FIXE") VALUES
  ('EUR', 'Euro',                 2, 'O', 0),
  ('USD', 'Dollar américain',     2, 'N', 0),
  ('GBP', 'Livre sterling',       2, 'N', 0),
  ('CHF', 'Franc suisse',         2, 'N', 0),
  ('JPY', 'Yen japonais',         0, 'N', 0),
  ('XPF', 'Franc CFP',            0, 'N', 119.331742);

-- VAT -----------------------------------------------------------------------------------

-- Sales VAT is due on debits for goods (CITVA) and on receipts for services (CETVA,
-- until the receipt); the revenue accounts say which through TPTVA. Deductible VAT goes
-- to 445660, or 445620 for fixed assets (code I20).
INSERT INTO "CDTVA" ("COTVA", "LIBELLE", "TYTVA", "CITVA", "CETVA", "DETVA") VALUES
  ('V20', 'TVA collectée taux normal',         'V', '445711', '445800', '445660'),
  ('V10', 'TVA collectée taux intermédiaire',  'V', '445713', '445800', '445660'),
  ('V55', 'TVA collectée taux réduit',         'V', '445712', '445800', '445660'),
  ('V21', 'TVA collectée taux particulier',    'V', '445714', '445800', '445660'),
  ('A20', 'TVA déductible taux normal',        'A', '445660', '445660', '445660'),
  ('A10', 'TVA déductible taux intermédiaire', 'A', '445660', '445660', '445660'),
  ('A55', 'TVA déductible taux réduit',        'A', '445660', '445660', '445660'),
  ('A21', 'TVA déductible taux particulier',   'A', '445660', '445660', '445660'),
  ('I20', 'TVA déductible sur immobilisations','A', '445620', '445620', '445620');

-- Standard rate 19.6 % until 31/12/2013, then 20 %; intermediate rate 7 % from 2012,
-- then 10 %; reduced rate 5.5 %; particular rate 2.1 %.
INSERT INTO "HISTVA" ("COTVA", "DTDEB", "TXTVA") VALUES
  ('V20', '2000-04-01', 19.6), ('V20', '2014-01-01', 20),
  ('A20', '2000-04-01', 19.6), ('A20', '2014-01-01', 20),
  ('I20', '2000-04-01', 19.6), ('I20', '2014-01-01', 20),
  ('V10', '2012-01-01', 7),    ('V10', '2014-01-01', 10),
  ('A10', '2012-01-01', 7),    ('A10', '2014-01-01', 10),
  ('V55', '1982-07-01', 5.5),  ('A55', '1982-07-01', 5.5),
  ('V21', '1989-01-01', 2.1),  ('A21', '1989-01-01', 2.1);

-- Chart of accounts ---------------------------------------------------------------------

-- Natures: "C" client, "F" supplier, "A" staff, "B" bank, "I" cash, "P" revenue,
-- "H" expense, "M" fixed asset, "T" VAT account, "U" lines carry VAT. A revenue account
-- owes its VAT on debits ("D", goods) or on receipts ("E", services).
INSERT INTO "COMPT" ("NUMCP", "LIBCP", "NATUC", "COTVA", "TPTVA", "CTYPR", "JLTRT", "CTYEC", "RGPAY") VALUES
  -- Class 1: equity and borrowings
  ('101300', 'Capital souscrit, appelé, versé',           '',   '',    '', '', '', '', ''),
  ('106100', 'Réserve légale',                             '',   '',    '', '', '', '', ''),
  ('108000', 'Compte de l''exploitant',                    '',   '',    '', '', '', '', ''),
  ('110000', 'Report à nouveau créditeur',                 '',   '',    '', '', '', '', ''),
  ('119000', 'Report à nouveau débiteur',                  '',   '',    '', '', '', '', ''),
  ('120000', 'Résultat de l''exercice (bénéfice)',         '',   '',    '', '', '', '', ''),
  ('129000', 'Résultat de l''exercice (perte)',            '',   '',    '', '', '', '', ''),
  ('164000', 'Emprunts auprès des établissements de crédit', '', '',    '', '', '', '', ''),
  -- Class 2: fixed assets
  ('205000', 'Logiciels, brevets, licences',               'MU', 'I20', '', '', '', '', ''),
  ('207000', 'Fonds commercial',                           'M',  '',    '', '', '', '', ''),
  ('211000', 'Terrains',                                   'M',  '',    '', '', '', '', ''),
  ('213500', 'Installations générales, agencements',      'MU', 'I20', '', '', '', '', ''),
  ('215400', 'Matériel industriel',                        'MU', 'I20', '', '', '', '', ''),
  ('218200', 'Matériel de transport',                      'MU', 'I20', '', '', '', '', ''),
  ('218300', 'Matériel de bureau et informatique',         'MU', 'I20', '', '', '', '', ''),
  ('218400', 'Mobilier',                                   'MU', 'I20', '', '', '', '', ''),
  ('275000', 'Dépôts et cautionnements versés',           'M',  '',    '', '', '', '', ''),
  ('280500', 'Amortissements des logiciels',               '',   '',    '', '', '', '', ''),
  ('281350', 'Amortissements des agencements',            '',   '',    '', '', '', '', ''),
  ('281540', 'Amortissements du matériel industriel',      '',   '',    '', '', '', '', ''),
  ('281820', 'Amortissements du matériel de transport',    '',   '',    '', '', '', '', ''),
  ('281830', 'Amortissements du matériel de bureau',       '',   '',    '', '', '', '', ''),
  ('281840', 'Amortissements du mobilier',                 '',   '',    '', '', '', '', ''),
  -- Class 3: stocks
  ('310000', 'Stocks de matières premières',              '',   '',    '', '', '', '', ''),
  ('355000', 'Stocks de produits finis',                   '',   '',    '', '', '', '', ''),
  ('370000', 'Stocks de marchandises',                     '',   '',    '', '', '', '', ''),
  -- Class 4: third parties
  ('401000', 'Fournisseurs',                               'F',  '',    '', '30J', 'BQ', 'FACT', 'VIR'),
  ('404000', 'Fournisseurs d''immobilisations',            'F',  '',    '', '30J', 'BQ', 'FACT', 'VIR'),
  ('408000', 'Fournisseurs, factures non parvenues',       '',   '',    '', '', '', '', ''),
  ('409100', 'Fournisseurs, avances et acomptes versés',  '',   '',    '', '', '', '', ''),
  ('411000', 'Clients',                                    'C',  '',    '', '30J', 'BQ', 'FACT', 'VIR'),
  ('416000', 'Clients douteux ou litigieux',               'C',  '',    '', '', 'BQ', 'FACT', ''),
  ('418000', 'Clients, produits non encore facturés',     '',   '',    '', '', '', '', ''),
  ('419100', 'Clients, avances et acomptes reçus',         '',   '',    '', '', '', '', ''),
  ('421000', 'Personnel, rémunérations dues',             'A',  '',    '', '', 'BQ', 'FACT', 'VIR'),
  ('425000', 'Personnel, avances et acomptes',             '',   '',    '', '', '', '', ''),
  ('428600', 'Personnel, charges à payer',                 '',   '',    '', '', '', '', ''),
  ('431000', 'Sécurité sociale',                           '',   '',    '', '', '', '', ''),
  ('437000', 'Autres organismes sociaux',                  '',   '',    '', '', '', '', ''),
  ('442100', 'Prélèvement à la source',                   '',   '',    '', '', '', '', ''),
  ('444000', 'État, impôt sur les bénéfices',             '',   '',    '', '', '', '', ''),
  ('445510', 'TVA à décaisser',                            'T',  '',    '', '', '', '', ''),
  ('445620', 'TVA déductible sur immobilisations',         'T',  '',    '', '', '', '', ''),
  ('445660', 'TVA déductible sur ABS',                     'T',  '',    '', '', '', '', ''),
  ('445670', 'Crédit de TVA à reporter',                   'T',  '',    '', '', '', '', ''),
  ('445711', 'TVA collectée 20 %',                         'T',  '',    '', '', '', '', ''),
  ('445712', 'TVA collectée 5,5 %',                        'T',  '',    '', '', '', '', ''),
  ('445713', 'TVA collectée 10 %',                         'T',  '',    '', '', '', '', ''),
  ('445714', 'TVA collectée 2,1 %',                        'T',  '',    '', '', '', '', ''),
  ('445800', 'TVA collectée sur encaissements',            'T',  '',    '', '', '', '', ''),
  ('447000', 'Autres impôts, taxes et versements',         '',   '',    '', '', '', '', ''),
  ('455000', 'Associés, comptes courants',                 '',   '',    '', '', '', '', ''),
  ('467000', 'Autres comptes débiteurs ou créditeurs',     '',   '',    '', '', '', '', ''),
  ('471000', 'Compte d''attente',                          '',   '',    '', '', '', '', ''),
  ('486000', 'Charges constatées d''avance',               '',   '',    '', '', '', '', ''),
  ('487000', 'Produits constatés d''avance',               '',   '',    '', '', '', '', ''),
  -- Class 5: treasury
  ('512000', 'Banque',                                     'B',  '',    '', '', '', '', ''),
  ('530000', 'Caisse',                                     'I',  '',    '', '', '', '', ''),
  ('580000', 'Virements internes',                         '',   '',    '', '', '', '', ''),
  -- Class 6: expenses
  ('601000', 'Achats de matières premières',               'HU', 'A20', '', '', '', '', ''),
  ('602200', 'Fournitures consommables',                   'HU', 'A20', '', '', '', '', ''),
  ('604000', 'Achats d''études et prestations',            'HU', 'A20', '', '', '', '', ''),
  ('606100', 'Eau, énergie',                               'HU', 'A20', '', '', '', '', ''),
  ('606300', 'Petit équipement',                           'HU', 'A20', '', '', '', '', ''),
  ('606400', 'Fournitures administratives',                'HU', 'A20', '', '', '', '', ''),
  ('607000', 'Achats de marchandises',                     'HU', 'A20', '', '', '', '', ''),
  ('613200', 'Locations immobilières',                     'HU', 'A20', '', '', '', '', ''),
  ('613500', 'Locations mobilières',                       'HU', 'A20', '', '', '', '', ''),
  ('615000', 'Entretien et réparations',                   'HU', 'A20', '', '', '', '', ''),
  ('616000', 'Primes d''assurances',                       'H',  '',    '', '', '', '', ''),
  ('622600', 'Honoraires',                                 'HU', 'A20', '', '', '', '', ''),
  ('623000', 'Publicité, publications',                    'HU', 'A20', '', '', '', '', ''),
  ('624100', 'Transports sur achats',                      'HU', 'A20', '', '', '', '', ''),
  ('625100', 'Voyages et déplacements',                    'HU', 'A10', '', '', '', '', ''),
  ('625600', 'Missions',                                   'HU', 'A10', '', '', '', '', ''),
  ('625700', 'Réceptions',                                 'HU', 'A10', '', '', '', '', ''),
  ('626000', 'Frais postaux et de télécommunications',     'HU', 'A20', '', '', '', '', ''),
  ('627000', 'Services bancaires',                         'H',  '',    '', '', '', '', ''),
  ('635100', 'Impôts directs',                             'H',  '',    '', '', '', '', ''),
  ('641000', 'Rémunérations du personnel',                 'H',  '',    '', '', '', '', ''),
  ('645000', 'Charges de sécurité sociale',                'H',  '',    '', '', '', '', ''),
  ('658000', 'Charges diverses de gestion courante',       'H',  '',    '', '', '', '', ''),
  ('661100', 'Intérêts des emprunts',                      'H',  '',    '', '', '', '', ''),
  ('666000', 'Pertes de change',                           'H',  '',    '', '', '', '', ''),
  ('671200', 'Pénalités et amendes',                       'H',  '',    '', '', '', '', ''),
  ('681100', 'Dotations aux amortissements',               'H',  '',    '', '', '', '', ''),
  ('695000', 'Impôts sur les bénéfices',                   'H',  '',    '', '', '', '', ''),
  -- Class 7: revenue
  ('701000', 'Ventes de produits finis',                   'PU', 'V20', 'D', '', '', '', ''),
  ('706000', 'Prestations de services',                    'PU', 'V20', 'E', '', '', '', ''),
  ('707000', 'Ventes de marchandises',                     'PU', 'V20', 'D', '', '', '', ''),
  ('708500', 'Ports et frais accessoires facturés',        'PU', 'V20', 'D', '', '', '', ''),
  ('709000', 'Rabais, remises et ristournes accordés',     'PU', 'V20', 'D', '', '', '', ''),
  ('740000', 'Subventions d''exploitation',                'P',  '',    '', '', '', '', ''),
  ('758000', 'Produits divers de gestion courante',        'P',  '',    '', '', '', '', ''),
  ('766000', 'Gains de change',                            'P',  '',    '', '', '', '', ''),
  ('768000', 'Autres produits financiers',                 'P',  '',    '', '', '', '', ''),
  ('771000', 'Produits exceptionnels de gestion',          'P',  '',    '', '', '', '', ''),
  ('775000', 'Produits des cessions d''éléments d''actif', 'P',  '',    '', '', '', '', '');

-- Journals ------------------------------------------------------------------------------

-- The entry screens propose the first journal of their nature in code order: OD for
-- miscellaneous operations, before ODC and ODE. Sales invoices are numbered on one
-- sequence through the exercise.
INSERT INTO "JONAL" ("NUMJL", "LIBELLE", "TYPJL", "NUMEROPI", "PREFIXPI", "PREFIXIN", "RAZPI",
                     "CLOAM", "CPTRE", "MONNAIE_IDENT") VALUES
  ('VT',  'Ventes',              'V', 'A', 'VT', '', 'N', '', '',       '{{MONNAIE}}'),
  ('AC',  'Achats',              'A', 'A', '',   '', 'N', '', '',       '{{MONNAIE}}'),
  ('BQ',  'Banque',              'T', 'A', '',   '', 'N', '', '512000', '{{MONNAIE}}'),
  ('CA',  'Caisse',              'T', 'A', '',   '', 'N', '', '530000', '{{MONNAIE}}'),
  ('OD',  'Opérations diverses', 'O', 'A', '',   '', 'N', '', '',       '{{MONNAIE}}'),
  ('ODC', 'Écarts de change',    'O', 'A', '',   '', 'N', '', '',       '{{MONNAIE}}'),
  ('ODE', 'Écarts d''arrondi',   'O', 'A', '',   '', 'N', '', '',       '{{MONNAIE}}');

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

INSERT INTO "NDOC" ("NOM", "DERNIER") VALUES
  ('ECHEA',    0),
  ('MIRVAANA', 0),
  ('MIRVAE',   0),
  ('MIRVAL',   0);
