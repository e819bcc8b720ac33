// What the entry screens of the kinds share and where they differ: their branch
// tables, a new operation's defaults, the supplier's account natures, the expense
// note's counterparty and line labels, and the direction, line accounts and running
// balance of bank and cash operations.
#include <gtest/gtest.h>

#include <algorithm>
#include <utility>

#include "tests/entry/gestion1_fixture.h"

namespace {

using registry::operationKind;
using testing_support::Gestion1Test;

class KindsTest : public Gestion1Test {};

TEST_F(KindsTest, EachKindRegistersEveryBranchOnceInItsOrder) {
  // The client invoice's, in the order of its registration.
  const std::vector<std::string> invoice = {
      "INIT", "CTRL_DEFAUT_COLONNE", "CTRL_CUSTOM_COLONNE", "CTRL_CACHE_COLONNE ", "AVANT_DEBUT", "DEBUT",
      "SELECTION_TRI", "COMMANDE1", "INFO_FICHE", "CONSTITUER_INFO_FICHE", "COMPLETER_INFO_FICHE", "IMPRIME",
      "IMPR_FICHE", "MODIFICATION", "CREAT2", "DEBUT_VISUALISATION", "DEBUT_MODIFICATION", "DEBUT_CREATION",
      "APRES_DEBUT_CREATION", "FIN_CREATION", "IMPORTATION_LIGNES", "DEBUT_FICHE", "V_CMODEL",
      "V_CMODEL_CHOISIR", "MODTE_CHOISIR", "MODTE_GENERER", "DTOPE", "VLIBCP1", "COMPT1_CHOISIR",
      "CONTROLER_COMPT", "NPIEC_ENTREE", "NPIEC", "PREFIXE_NUMERO_PIECE", "INPIE_ENTREE",
      "PREFIXE_INTITULE_PIECE", "P1_SORTIE", "GRP1_SORTIE", "CONTROLER_P1", "CONTROLER_GRP1", "SELECTION",
      "CTRL_DEBUT_LIGNE", "DEBUT_CREATION_LIGNE", "GESTION_ANALY_OUI_NON", "LST_ENTREE",
      "INCREMENTE_NUMERO_PIECE", "V_SAISIE_COMPT2_FERME", "V_SAISIE_COMPT", "SAISIE_MTT", "LST_MIRVAL.NUMCP",
      "LST_VLIBCP2", "COMPT2_CHOISIR", "LST_V_HT", "LST_MIRVAL.COTVA", "CDTVA_CHOISIR", "LST_MIRVAL.TVA",
      "CALCUL_MTT_LIGNE", "CALCUL_TVA_SELON_HT", "CALCUL_TVA_SELON_TTC", "CALCUL_TTC", "CALCUL_HT",
      "B_VALID_DOC", "VALID_DOC", "VALIDATION", "CONTROLER_LST", "APRES_VALIDATION", "AVANT_SUPPRESSION",
      "B_ABAND_DOC", "VALIDATION_LIGNE", "APRES_VALIDATION_LIGNE", "APRES_SUPPRESSION_LIGNE", "BT_ANALYTIQUE",
      "APPEL_ANALYTIQUE", "CALCUL_TOTAUX", "EXTRACTION_DONNEES", "EXTRACTION_TABLE_MIRVAANA",
      "SUPPRESSION_DONNEES", "SUPPRESSION_TABLE_MIRVAANA", "VALIDATION_DONNEES", "VALIDATION_TABLE_MIRVAANA",
      "CTRL_CHOISIR", "CTRL_OUVRE", "DIALOGUE", "MONNAIE_CHOISIR", "MONNAIE_IDENT", "COURS", "CTRL_BASCULER",
      "CTRL_ACTUALISER_MODE", "CTRL_ACTUALISER_BASCULE", "ACTUALISER_INFO_MONETAIRES", "DEFINIR_BASCULE",
      "MAJ_LIGNES_MEMOIRE",
  };
  const std::vector<std::string> models = {"V_CMODEL", "V_CMODEL_CHOISIR", "MODTE_CHOISIR", "MODTE_GENERER"};
  const std::vector<std::string> treasury = {
      "TYPE_DR", "CALCUL_SOLDE", "AFFICHER_SOLDE", "TYPLB_CHOISIR", "TESTS_VALIDATION", "BT_JUSTIF",
      "APPEL_JUSTIFICATION", "EXTRACTION_TABLE_MIRVAJUS", "SUPPRESSION_TABLE_MIRVAJUS", "VALIDATION_TABLE_MIRVAJUS"};
  const struct {
    int kind;
    std::vector<std::string> left, added;
  } cases[] = {
      {1, {}, {}},
      {2, {}, {}},
      {3, models, {"VTIERS1", "VTIERS1_FERME", "FAIT_INPIE", "TYPFR_CHOISIR", "LST_MIRVAL.LIBEC", "LIRE_LIGNE_PRECEDENTE"}},
      {4, {}, treasury},
      {5, {}, treasury},
      {6,
       {"VLIBCP1", "COMPT1_CHOISIR", "LST_VLIBCP2", "COMPT2_CHOISIR"},
       {"COMPT_CHOISIR", "LST_VLIBCP", "LST_VLIBSENS_DC", "CALCUL_DC", "TYPLB_CHOISIR", "TESTS_VALIDATION",
        "EXTRACTION_TABLE_MIRVAJUS", "SUPPRESSION_TABLE_MIRVAJUS", "VALIDATION_TABLE_MIRVAJUS"}},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.kind);
    kind_ = c.kind;
    std::vector<std::string> expected;
    std::copy_if(invoice.begin(), invoice.end(), std::back_inserter(expected),
                 [&](const std::string& name) { return std::find(c.left.begin(), c.left.end(), name) == c.left.end(); });
    expected.insert(expected.end(), c.added.begin(), c.added.end());
    ASSERT_TRUE(creer());
    EXPECT_EQ(ecran().branches(), expected);
    // A part the kind lacks leaves none of its declarations behind.
    EXPECT_EQ(ecran().variable("V_CMODEL") != nullptr, c.kind != 3);
    EXPECT_EQ(ecran().variable("VLIBCP2") != nullptr, c.kind != 6);
    model::fermer(session());
  }
}

TEST_F(KindsTest, ANewOperationTakesItsKindsDefaults) {
  // Bank and cash: the first account of the kind by number, the journal that keeps
  // it, a receipt typed with its taxes, no due date.
  const struct {
    int kind;
    const char *type, *journal, *label, *account, *dueDate, *amountTyped, *direction;
  } cases[] = {
      {1, "FC", "VT", "Facture client n° ", "", "15/03/2024", "1", ""},
      {2, "FF", "AC", "Facture fournisseur n° ", "", "15/03/2024", "1", ""},
      {3, "NDF", "AC", "Note de frais personnel n° ", "", "15/03/2024", "1", ""},
      {4, "BQ", "BQ1", "Opération bancaire", "512100", "", "2", "R"},
      {5, "CA", "CA", "Opération de caisse", "530000", "", "2", "R"},
      {6, "OD", "OD", "Opération diverse", "", "", "2", ""},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.kind);
    kind_ = c.kind;
    ASSERT_TRUE(creer());
    EXPECT_EQ(valeur("MIRVAE.TYPE"), c.type);
    EXPECT_EQ(valeur("MIRVAE.NUMJL"), c.journal);
    EXPECT_EQ(valeur("MIRVAE.NUMCP"), c.account);
    EXPECT_EQ(valeur("MIRVAE.DTECH"), c.dueDate);
    EXPECT_EQ(valeur("MIRVAE.SAISIE_MTT"), c.amountTyped);
    EXPECT_EQ(valeur("MIRVAE.TYPE_DR"), c.direction);
    EXPECT_TRUE(valeur("MIRVAE.INPIE").starts_with(c.label)) << valeur("MIRVAE.INPIE");
    model::fermer(session());
  }
}

TEST_F(KindsTest, ASupplierLineTakesAChargeOrAFixedAssetAndIsToldBothNatures) {
  kind_ = 2;
  ASSERT_TRUE(creer());
  ASSERT_TRUE(client("Scierie Maurel Frères"));
  EXPECT_TRUE(ligne("218300", "100"));
  EXPECT_TRUE(ligne("601000", "100"));
  EXPECT_FALSE(ligne("708500", "100"));
  EXPECT_EQ(dernierMessage(), "Le compte n'est pas de nature <Charge>@ni <Immobilisation>");
  // The header account is a supplier's.
  EXPECT_FALSE(client("Brasserie Lissandre"));
  EXPECT_EQ(dernierMessage(), "Le compte n'est pas de nature <Fournisseur>");
}

TEST_F(KindsTest, AnExpenseNoteIsAStaffMembersUntilItsCounterpartyTypeChanges) {
  kind_ = 3;
  ASSERT_TRUE(creer());
  EXPECT_EQ(valeur("VTIERS"), "P");
  // Staff are chosen by number among the accounts beginning with 421.
  user_.ajouterChoix("421002");
  ASSERT_TRUE(model::ouvrirChoix(session(), "VLIBCP1"));
  EXPECT_EQ(session().transcript().textes("choix").back(), "Comptes de nature A commençant par 421");
  EXPECT_EQ(valeur("VLIBCP1"), "Roques Émilie");
  EXPECT_EQ(valeur("MIRVAE.NUMCP"), "421002");
  // A supplier: the staff member goes and the label follows.
  ASSERT_TRUE(saisir("VTIERS", "F"));
  ASSERT_TRUE(appuyer("VTIERS1"));
  EXPECT_EQ(valeur("VLIBCP1"), "");
  EXPECT_EQ(valeur("MIRVAE.NUMCP"), "");
  EXPECT_TRUE(valeur("MIRVAE.INPIE").starts_with("Facture frais fournisseur n° ")) << valeur("MIRVAE.INPIE");
  EXPECT_FALSE(client("Roques Émilie"));
  EXPECT_TRUE(client("Scierie Maurel Frères"));
  // No type, no choice.
  ASSERT_TRUE(saisir("VTIERS", ""));
  EXPECT_TRUE(model::ouvrirChoix(session(), "VLIBCP1"));
  EXPECT_EQ(dernierMessage(), "La saisie d'un type de tiers est obligatoire !");
}

TEST_F(KindsTest, AnExpenseLineIsLabelledByItsTypeOrByTheLineBefore) {
  kind_ = 3;
  ASSERT_TRUE(creer());
  ASSERT_TRUE(client("Bonnefon Lucas"));
  ASSERT_TRUE(ligne("625100", "40", "-", false));
  user_.ajouterChoix("REPAS");
  ASSERT_TRUE(model::ouvrirChoix(session(), "LST_MIRVAL.LIBEC"));
  EXPECT_EQ(valeur("LST_MIRVAL.LIBEC"), "Frais de repas");
  ASSERT_TRUE(model::validerLigne(session()));
  ASSERT_TRUE(ligne("625600", "12", "-", false));
  ASSERT_TRUE(saisir("LST_MIRVAL.LIBEC", " "));
  EXPECT_EQ(valeur("LST_MIRVAL.LIBEC"), "Frais de repas");
  // The line account choice opens on the travel expenses.
  user_.ajouterChoix("Réceptions");
  ASSERT_TRUE(model::ouvrirChoix(session(), "LST_MIRVAL.NUMCP"));
  EXPECT_EQ(session().transcript().textes("choix").back(), "Comptes de nature H commençant par 625");
}

TEST_F(KindsTest, AnExpenseNoteAndASupplierInvoiceOfTheSameLinesPostTheSameMovements) {
  // Charges and deductible VAT on the debit, a credit note's on the credit, the
  // counterparty on the credit for what is left: 120 - 44.
  const struct {
    int kind;
    const char *header, *account;
  } cases[] = {{2, "Scierie Maurel Frères", "401001"}, {3, "Bonnefon Lucas", "421001"}};
  std::vector<std::string> posted;
  for (const auto& c : cases) {
    SCOPED_TRACE(c.kind);
    kind_ = c.kind;
    ASSERT_TRUE(creer());
    ASSERT_TRUE(client(c.header));
    ASSERT_TRUE(ligne("601000", "100", "A20"));
    ASSERT_TRUE(ligne("625100", "-40", "A10"));
    EXPECT_EQ(valeur("V_TOT_TTC"), "76.00");
    ASSERT_TRUE(enregistrer());
    std::string piece = sql("SELECT NPIES FROM MIRVAE WHERE TYPE = '" + std::string(operationKind(c.kind).type) + "'");
    ASSERT_FALSE(piece.empty());
    EXPECT_EQ(sql("SELECT MTCRES FROM MOUVE WHERE NPIES = '" + piece + "' AND NUMCP = '" + c.account + "'"), "76");
    posted.push_back(sql("SELECT group_concat(NUMCP || ' ' || MTDEBS || ' ' || MTCRES, ', ') FROM (SELECT * FROM "
                         "MOUVE WHERE NPIES = '" + piece + "' AND NUMCP <> '" + c.account + "' ORDER BY NUMCP, MTDEBS)"));
    model::fermer(session());
  }
  EXPECT_EQ(posted[0], posted[1]);
  EXPECT_EQ(posted[0], "445660 0 4, 445660 20 0, 601000 100 0, 625100 0 40");
  EXPECT_TRUE(testing_support::incoherences(base()).empty());
}

// A miscellaneous line: account, side, then amount (including tax) or, on a VAT
// account, its VAT.
class MiscellaneousTest : public Gestion1Test {
 protected:
  void SetUp() override {
    Gestion1Test::SetUp();
    kind_ = 6;
  }
  bool ligneOd(const std::string& account, const std::string& sense, const std::string& amount, bool validate = true) {
    if (!model::nouvelleLigne(session()) || !saisir("LST_MIRVAL.NUMCP", account)) return false;
    if (!saisir("LST_VLIBSENS_DC", sense)) return false;
    bool vat = sql("SELECT instr(NATUC, 'T') > 0 FROM COMPT WHERE NUMCP = '" + account + "'") == "1";
    if (!saisir(vat ? "LST_MIRVAL.TVA" : "LST_V_HT", amount)) return false;
    return !validate || model::validerLigne(session());
  }
};

TEST_F(MiscellaneousTest, LineChecksFireInTheirOrder) {
  ASSERT_TRUE(creer());
  const struct {
    const char *account, *sense, *amount, *message;
  } cases[] = {
      {"", "D", "", "La saisie d'un compte général est obligatoire !"},
      {"445660", "D", "", "La saisie d'un montant TVA est obligatoire !"},
      {"627000", "D", "", "La saisie d'un montant TTC est obligatoire !"},
      {"627000", "", "12", "La saisie d'un sens D/C est obligatoire !"},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.message);
    ASSERT_TRUE(model::nouvelleLigne(session()));
    if (*c.account) {
      ASSERT_TRUE(saisir("LST_MIRVAL.NUMCP", c.account));
    }
    if (*c.sense) {
      ASSERT_TRUE(saisir("LST_VLIBSENS_DC", c.sense));
    }
    if (*c.amount) {
      ASSERT_TRUE(saisir("LST_V_HT", c.amount));
    }
    EXPECT_FALSE(model::validerLigne(session()));
    EXPECT_EQ(dernierMessage(), c.message);
    ASSERT_TRUE(model::abandonnerLigne(session()));
  }
}

TEST_F(MiscellaneousTest, AVatAccountTakesItsAmountAsVatAndAnUnbalancedPieceIsRefused) {
  ASSERT_TRUE(creer());
  // A VAT settlement: the VAT owed paid from the bank, the deductible VAT set off.
  ASSERT_TRUE(ligneOd("445711", "D", "500"));
  EXPECT_EQ(valeur("LST_MIRVAL.HT"), "0.00");
  EXPECT_EQ(valeur("LST_MIRVAL.TTC"), "500.00");
  EXPECT_TRUE(ecran().ecran()->estInterdit("LST_V_HT"));
  ASSERT_TRUE(ligneOd("445660", "C", "180"));
  ASSERT_TRUE(ligneOd("512100", "C", "300"));
  EXPECT_EQ(valeur("V_TOT_DEB"), "500.00");
  EXPECT_EQ(valeur("V_TOT_CRE"), "480.00");
  EXPECT_EQ(valeur("V_SOLDE"), "20.00");
  enregistrer();
  EXPECT_EQ(dernierMessage(),
            "L'opération n'est pas équilibrée : débit 500.00, crédit 480.00, écart 20.00.@La validation est impossible !");
  EXPECT_EQ(nombre("SELECT count(*) FROM MIRVAE"), 0);

  ASSERT_TRUE(model::allerLigne(session(), 3));
  ASSERT_TRUE(saisir("LST_V_HT", "320"));
  ASSERT_TRUE(model::validerLigne(session()));
  EXPECT_EQ(valeur("V_SOLDE"), "0.00");
  ASSERT_TRUE(enregistrer());
  EXPECT_EQ(sql("SELECT HT || ' ' || TVA || ' ' || TTC || ' ' || DEBPIS || ' ' || CREPIS FROM MIRVAE"),
            "320 680 1000 500 500");
  std::string piece = sql("SELECT NPIES FROM MIRVAE");
  EXPECT_EQ(sql("SELECT group_concat(NUMCP || ' ' || MTDEBS || ' ' || MTCRES, ', ') FROM (SELECT * FROM MOUVE "
                "WHERE NPIES = '" + piece + "' ORDER BY NUMCP)"),
            "445660 0 180, 445711 500 0, 512100 0 320");
  EXPECT_TRUE(testing_support::incoherences(base()).empty());
}

TEST_F(MiscellaneousTest, AModelGivesItsLinesSidesAndThePieceLabelComesFromTheStandardLabels) {
  ASSERT_TRUE(creer());
  ASSERT_TRUE(saisir("V_CMODEL", "ODCAISSE"));
  ASSERT_EQ(model::nombreLignes(session()), 2u);
  const struct {
    const char *account, *sense, *amount;
  } lines[] = {{"530000", "D", "150"}, {"512100", "C", "150"}};
  for (int i = 0; i < 2; ++i) {
    ASSERT_TRUE(model::allerLigne(session(), i + 1));
    EXPECT_EQ(valeur("LST_MIRVAL.NUMCP"), lines[i].account);
    EXPECT_EQ(valeur("LST_MIRVAL.SENS_DC"), lines[i].sense);
    EXPECT_EQ(valeur("LST_V_HT"), "0.00");
    ASSERT_TRUE(saisir("LST_V_HT", lines[i].amount));
    ASSERT_TRUE(model::validerLigne(session()));
  }
  // The piece label from the standard labels.
  user_.ajouterChoix("APPRO");
  ASSERT_TRUE(model::ouvrirChoix(session(), "MIRVAE.INPIE"));
  EXPECT_EQ(valeur("MIRVAE.INPIE"), "Approvisionnement de la caisse");
}

TEST_F(KindsTest, ABankLineTakesTheAccountOfItsDirectionTypedInFull) {
  // With lines on expense and revenue accounts (PRE19 "1"), a receipt takes a revenue
  // and a payment a charge; otherwise a client and a supplier.
  const struct {
    const char *pre19, *direction, *accepted, *refused, *refusal, *required;
  } cases[] = {
      {"1", "R", "706000", "601000", "Le compte n'est pas de nature <Produit> !",
       "La saisie d'un compte Produit est obligatoire !"},
      {"1", "D", "601000", "706000", "Le compte n'est pas de nature <Charge> !",
       "La saisie d'un compte Charge est obligatoire !"},
      {"", "R", "411001", "401001", "Le compte n'est pas de nature <Client> !",
       "La saisie d'un compte Tiers est obligatoire !"},
      {"", "D", "401001", "411001", "Le compte n'est pas de nature <Fournisseur> !",
       "La saisie d'un compte Tiers est obligatoire !"},
  };
  kind_ = 4;
  for (const auto& c : cases) {
    SCOPED_TRACE(std::string(c.pre19) + c.direction);
    sql("UPDATE PARAM SET PRE19 = '" + std::string(c.pre19) + "'");
    ASSERT_TRUE(creer());
    ASSERT_TRUE(saisir("MIRVAE.TYPE_DR", c.direction));
    EXPECT_FALSE(ligne(c.refused, "100"));
    EXPECT_EQ(dernierMessage(), c.refusal);
    EXPECT_FALSE(saisir("LST_MIRVAL.NUMCP", std::string(c.accepted).substr(0, 3) + "*"));
    EXPECT_EQ(dernierMessage(), "Vous devez choisir un n° de compte");
    EXPECT_TRUE(saisir("LST_MIRVAL.NUMCP", c.accepted));
    EXPECT_TRUE(saisir("LST_V_HT", "100"));
    EXPECT_TRUE(model::validerLigne(session()));
    EXPECT_FALSE(ligne("", "100"));
    EXPECT_EQ(dernierMessage(), c.required);
    model::fermer(session());
  }
}

TEST_F(KindsTest, TheBankBalanceFollowsEachLineAndCountsASavedOperationOnce) {
  kind_ = 4;
  ASSERT_TRUE(creer());
  EXPECT_EQ(valeur("V_SOLDE"), "0.00");
  EXPECT_EQ(valeur("V_TSOLDE"), "");
  // A receipt brings its lines in, a payment takes them out of what the ledger holds.
  const struct {
    const char *direction, *account, *amount, *balance, *side;
  } steps[] = {
      {"R", "411001", "1000", "1000.00", "D"},
      {"R", "411002", "250.50", "1250.50", "D"},
      {"D", "401001", "2000", "749.50", "C"},
      {"D", "401002", "-749.50", "0.00", ""},
  };
  for (const auto& step : steps) {
    SCOPED_TRACE(step.amount);
    if (valeur("MIRVAE.TYPE_DR") != step.direction) {
      // The receipt is saved: the payment starts from the ledger's balance.
      ASSERT_TRUE(enregistrer("2"));
      ASSERT_TRUE(saisir("MIRVAE.TYPE_DR", step.direction));
      EXPECT_EQ(valeur("V_SOLDE"), "1250.50");
    }
    ASSERT_TRUE(ligne(step.account, step.amount));
    EXPECT_EQ(valeur("V_SOLDE"), step.balance);
    EXPECT_EQ(valeur("V_TSOLDE"), step.side);
  }
  model::fermer(session());
  // The saved receipt, opened again, is not counted beside its own posted piece.
  std::string receipt = sql("SELECT IDENT FROM MIRVAE WHERE TYPE = 'BQ'");
  ASSERT_TRUE(ouvrirFiche(receipt, "VMCAm"));
  EXPECT_EQ(valeur("V_SOLDE"), "1250.50");
  EXPECT_EQ(valeur("V_TSOLDE"), "D");
}

TEST_F(KindsTest, AReceiptAndAPaymentPostTheirLinesAgainstTheAccount) {
  // Lines on revenue and charges; a receipt's VAT on sales owed on receipts (the
  // service's TPTVA "E"), a payment's deductible.
  sql("UPDATE PARAM SET PRE19 = '1'");
  const struct {
    int kind;
    const char *direction, *account, *amount, *posted;
  } cases[] = {
      {4, "R", "706000", "120", "445800 0 20, 512100 120 0, 706000 0 100"},
      {5, "D", "606400", "60", "445660 10 0, 530000 0 60, 606400 50 0"},
      {5, "D", "627000", "-15", "530000 15 0, 627000 0 15"},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.account);
    kind_ = c.kind;
    ASSERT_TRUE(creer());
    ASSERT_TRUE(saisir("MIRVAE.TYPE_DR", c.direction));
    ASSERT_TRUE(ligne(c.account, c.amount));
    ASSERT_TRUE(enregistrer());
    std::string piece = sql("SELECT NPIES FROM MIRVAE WHERE IDENT = (SELECT max(IDENT) FROM MIRVAE)");
    ASSERT_FALSE(piece.empty());
    EXPECT_EQ(sql("SELECT group_concat(NUMCP || ' ' || MTDEBS || ' ' || MTCRES, ', ') FROM (SELECT * FROM MOUVE "
                  "WHERE NPIES = '" + piece + "' ORDER BY NUMCP)"),
              c.posted);
    model::fermer(session());
  }
  EXPECT_TRUE(testing_support::incoherences(base()).empty());
}

// The disk is forced once for each operation saved and posted, and once for each
// removed: never for what only draws a number or keeps a line being typed.
TEST_F(KindsTest, OnlyTheSaveAndTheRemovalOfAnOperationForceTheDisk) {
  const struct {
    int kind;
    const char *header, *account;
  } cases[] = {
      {1, "Brasserie Lissandre", "706300"}, {2, "Scierie Maurel Frères", "601000"},
      {3, "Bonnefon Lucas", "625100"},      {4, "", "411001"},
      {5, "", "411001"},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.kind);
    kind_ = c.kind;
    long long forced = base().ecrituresForcees();
    auto newlyForced = [&] { return base().ecrituresForcees() - std::exchange(forced, base().ecrituresForcees()); };
    ASSERT_TRUE(creer());
    if (*c.header) {
      ASSERT_TRUE(saisir("VLIBCP1", c.header));
    }
    ASSERT_TRUE(ligne(c.account, "100"));
    ASSERT_TRUE(ligne(c.account, "20"));
    EXPECT_EQ(newlyForced(), 0);
    ASSERT_TRUE(enregistrer("1"));
    EXPECT_EQ(nombre("SELECT count(*) FROM MIRVAE WHERE NPIES <> ''"), 1);
    EXPECT_EQ(newlyForced(), 1);
    model::fermer(session());
    ASSERT_TRUE(ouvrirFiche(sql("SELECT IDENT FROM MIRVAE"), "VMCAv"));
    ASSERT_TRUE(appuyer("SUPPRESSION")) << session().transcript().rendu();
    EXPECT_EQ(nombre("SELECT count(*) FROM MIRVAE") + nombre("SELECT count(*) FROM PIECE"), 0);
    EXPECT_EQ(newlyForced(), 1);
  }
}

TEST_F(KindsTest, ALineAccountClosedOrGoneBeforeSavingStopsTheSave) {
  const struct {
    const char *account, *change, *dialogue, *shown;
  } cases[] = {
      {"411001", "UPDATE COMPT SET CCTRA = 'O' WHERE NUMCP = '411001'",
       "Information : Le compte suivant est interdit en saisie : 411001 | 1~OK | 2~Voir le mémo",
       "Un compte interdit en saisie ne reçoit plus d'écriture."},
      {"411002", "DELETE FROM COMPT WHERE NUMCP = '411002'", "", "Le compte suivant est inexistant : 411002"},
  };
  kind_ = 4;
  for (const auto& c : cases) {
    SCOPED_TRACE(c.change);
    ASSERT_TRUE(creer());
    ASSERT_TRUE(ligne(c.account, "80"));
    sql(c.change);
    user_.ajouterDialogue("1");
    if (*c.dialogue) user_.ajouterDialogue("2");  // sees the memo
    appuyer("B_VALID_DOC");
    if (*c.dialogue) {
      EXPECT_EQ(session().transcript().textes("dialogue").back(), c.dialogue);
    }
    EXPECT_TRUE(dernierMessage().starts_with(c.shown)) << dernierMessage();
    EXPECT_EQ(nombre("SELECT count(*) FROM MIRVAE"), 0);
    model::fermer(session());
  }
}

}  // namespace

// A bank line on a client opens the justification of its due dates when the dossier
// justifies them; a line that changes account loses what it justified.
TEST_F(KindsTest, ABankLineJustifiesItsClientsDueDatesAndLosesThemWithItsAccount) {
  sql("INSERT INTO PIECE (NPIES, NPIEC, NUMJL, DTOPE, DTPIE, MONNAIE_IDENT, COURS) VALUES ('00000000001', 'VT1', "
      "'VT', '2024-03-01', '2024-03-01', 'EUR', 1)");
  sql("INSERT INTO MOUVE (UNIQ, NPIES, NLIGS, NUMCP, NUMJL, DTOPE, MTDEB, INDX2) VALUES (1, '00000000001', "
      "'000000000010001', '411001', 'VT', '2024-03-01', '1200', '411001|2024-03-01')");
  sql("INSERT INTO ECHEA (NUSYS, UNIQ, NPIES, INDX1, DTECH, MTECH, MTECHS, MTRES, MTRESS) VALUES (1, 1, "
      "'00000000001', '1', '2024-04-01', '1200', '1200', '1200', '1200')");
  auto justifier = [this] {
    user_.ajouterPilotage([](host::Session& s, host::Automate&) {
      model::appuyer(s, "VALID");  // the remainder on the due date
      model::appuyer(s, "VALID");
    });
  };
  auto ouvertures = [this] {
    auto shown = session().transcript().textes("ouvre");
    return std::count(shown.begin(), shown.end(), "MIRVAE-GEST_JUS");
  };
  kind_ = 4;
  const struct {
    const char *cas, *pfo13, *then, *amount;
    long long opened, kept;
  } cases[] = {
      {"non géré par le dossier", "N", "", "", 0, 0},
      {"justifiée", "O", "", "", 1, 1},
      {"autre client", "O", "411002", "1200", 2, 0},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.cas);
    sql("UPDATE PARAM SET PFO13 = '" + std::string(c.pfo13) + "'");
    ASSERT_TRUE(creer());
    session().transcript().vider();
    if (*c.pfo13 == 'O') justifier();
    ASSERT_TRUE(ligne("411001", "1200"));
    if (*c.then) {
      ASSERT_TRUE(model::allerLigne(session(), 1));
      ASSERT_TRUE(saisir("LST_MIRVAL.NUMCP", c.then));
      ASSERT_TRUE(saisir("LST_V_HT", c.amount));
      ASSERT_TRUE(model::validerLigne(session()));
    }
    EXPECT_EQ(ouvertures(), c.opened);
    EXPECT_EQ(nombre("SELECT count(*) FROM MIRVAJUS_M01"), c.kept);
    model::fermer(session());
    sql("DELETE FROM MIRVAJUS_M01");
  }
}
