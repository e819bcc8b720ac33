-- Host label texts of a dossier, read by label code (LIBE1 first, then LIBEL).
-- LIBE1 stays empty here: it is where a dossier overrides a text of its own.
-- In a message text "@" starts a new line. A label that the screens follow with a value
-- (an account number, another label) ends with the blank or the line break it needs.

-- Dossier and exercise
INSERT INTO "LIBEL" ("CODE", "TEXTE") VALUES
  ('0028',   'Les paramètres du dossier sont introuvables.@Renseignez les paramètres du dossier avant toute saisie.'),
  ('0240',   'L''exercice est clôturé.@Aucune création ni modification n''est possible.'),
  ('02401',  'L''exercice est clôturé, mais il peut encore être rouvert.@'),
  ('024011', 'Voulez-vous lancer la réouverture de l''exercice ?');

-- Operation entry
INSERT INTO "LIBEL" ("CODE", "TEXTE") VALUES
  ('0012',   'Le compte suivant est inexistant : '),
  ('00361',  'Le compte suivant est interdit en saisie : '),
  ('0134',   'La date d''opération est antérieure à la date de début d''exercice !'),
  ('0135',   'La date d''opération est postérieure à la date de clôture du dossier !'),
  ('0413',   'Le journal est en numérotation manuelle.@La saisie d''un numéro de pièce est obligatoire !'),
  ('0415',   'Le modèle d''écriture est inexistant !');

-- Settlement justification
INSERT INTO "LIBEL" ("CODE", "TEXTE") VALUES
  ('0158',   'Aucune échéance à justifier pour ce compte.'),
  ('01581',  'Ce mouvement annule l''encaissement d''un effet à recevoir :@il ne justifie aucune échéance.'),
  ('01582',  'Ce mouvement annule un effet à recevoir :@il ne justifie aucune échéance.'),
  ('01583',  'Ce mouvement annule un effet à payer :@il ne justifie aucune échéance.'),
  ('01584',  'Ce mouvement annule le règlement d''un effet à payer :@il ne justifie aucune échéance.'),
  ('0159',   'Le règlement n''est justifié qu''en partie.@Justifiez la totalité du montant, ou aucune échéance.'),
  ('01592',  'La justification a été modifiée.@Voulez-vous quitter sans l''enregistrer ?'),
  ('01593',  'Le montant de l''échéance dépasse le reste à justifier du règlement !'),
  ('01594',  'Le reste à justifier dépasse le montant de l''échéance !'),
  ('0167',   'Ce règlement est déjà justifié.@Voulez-vous annuler la justification existante pour la ressaisir ?');

-- Account natures, one label per nature letter of COMPT.NATUC, as messages name them
-- ("Le compte n'est pas de nature <Client> !").
INSERT INTO "LIBEL" ("CODE", "TEXTE") VALUES
  ('NATURE_A', 'Personnel'),
  ('NATURE_B', 'Banque'),
  ('NATURE_C', 'Client'),
  ('NATURE_D', 'Divers'),
  ('NATURE_F', 'Fournisseur'),
  ('NATURE_H', 'Charge'),
  ('NATURE_I', 'Caisse'),
  ('NATURE_M', 'Immobilisation'),
  ('NATURE_P', 'Produit'),
  ('NATURE_Q', 'Analytique'),
  ('NATURE_R', 'Effet à recevoir'),
  ('NATURE_S', 'Effet à payer'),
  ('NATURE_T', 'TVA'),
  ('NATURE_U', 'Soumis à TVA');

-- Memos shown on request beside a message
INSERT INTO "LIBEL" ("CODE", "TEXTE") VALUES
  ('MEMO1.TXT',
   'Un compte interdit en saisie ne reçoit plus d''écriture.@Choisissez un autre compte pour cette ligne, ou levez l''interdiction sur la fiche du compte s''il doit de nouveau servir.');
