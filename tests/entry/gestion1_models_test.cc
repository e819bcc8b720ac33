// Prefilling a client invoice: entry models chosen by their code, and the copy of a
// duplicated operation at the rate of the day.
#include <gtest/gtest.h>

#include "tests/entry/gestion1_fixture.h"

namespace {

using testing_support::Gestion1Test;

class ModelesTest : public Gestion1Test {
 protected:
  // What the list shows of each line: account, label, VAT code, rate, HT.
  std::vector<std::string> lignesAffichees() {
    std::vector<std::string> out;
    for (auto& row : model::lignes(session()))
      out.push_back(row["MIRVAL.NUMCP"] + " | " + row["MIRVAL.LIBEC"] + " | " + row["MIRVAL.COTVA"] + " | " +
                    row["MIRVAL.TXTVA"] + " | " + row["MIRVAL.HT"]);
    return out;
  }
};

using Lignes = std::vector<std::string>;

TEST_F(ModelesTest, AModelReplacesTheLinesAlreadyTyped) {
  ASSERT_TRUE(creer());
  ASSERT_TRUE(client());
  ASSERT_TRUE(ligne("708500", "100"));
  ASSERT_TRUE(ligne("758000", "50"));
  ASSERT_EQ(valeur("V_TOT_HT"), "150.00");

  // VTPOSE: a counterpart line ("C"), the root "706" with a label and no VAT code,
  // 707000 without label, a VAT line ("T").
  ASSERT_TRUE(saisir("V_CMODEL", "VTPOSE"));
  EXPECT_EQ(lignesAffichees(), (Lignes{"706000 | Pose et ajustage | V20 | 20 | 0.00",
                                       "707000 | Facture pose n° [PIECE] | V20 | 20 | 0.00"}));
  EXPECT_EQ(valeur("MIRVAE.INPIE"), "Facture pose n° [PIECE]");
  // The replaced lines' amounts are gone from the totals: the piece is empty until typed.
  EXPECT_EQ(valeur("V_TOT_HT"), "0.00");
  EXPECT_EQ(valeur("V_TOT_TTC"), "0.00");
  for (auto& row : model::lignes(session())) EXPECT_EQ(row["MIRVAL.IDENT"].size(), 8u);
}

TEST_F(ModelesTest, ModelLinesTakeTheirAccountLabelAndVatFromTheDossier) {
  sql("INSERT INTO MODTE (CODE, NUMJL, NPIEC, INPIE) VALUES ('VTESSAI', 'VT', 'M-12', 'Essai du modèle')");
  const struct {
    const char* account;
    const char* label;
    const char* vat;
  } lines[] = {
      {"C", "", ""},                             // counterpart: made by the posting
      {"411002", "", ""},                        // a client: the header's account
      {"7063", "", ""},                          // a root: 706300, its label and its VAT code
      {"706000", "Pose", "V55"},                 // label and VAT code of the model
      {"799", "Inconnu", ""},                    // no account begins with it: skipped
      {"401001", "Fournisseur", ""},             // not a revenue account: skipped
      {"7071", "Export", ""},                    // 707100 has no VAT code at all
      {"T", "", ""},                             // VAT: made by the posting
  };
  int n = 0;
  for (const auto& l : lines) {
    host::Statement& s = base().prepare(
        "INSERT INTO MODLI (CODE, NLIGNE, COL_NUMCP, COL_LIBEC, COL_COTVA) VALUES ('VTESSAI', printf('%-11s%03d', "
        "'VTESSAI', ?), ?, ?, ?)");
    s.bind(1, static_cast<long long>(++n)).bind(2, std::string(l.account)).bind(3, std::string(l.label));
    s.bind(4, std::string(l.vat));
    s.step();
    s.reset();
  }
  // A model whose code begins like this one's keeps its lines to itself.
  sql("INSERT INTO MODLI (CODE, NLIGNE, COL_NUMCP) VALUES ('VTESSAI2', printf('%-11s%03d', 'VTESSAI2', 1), "
      "'708500')");

  ASSERT_TRUE(creer());
  ASSERT_TRUE(saisir("V_CMODEL", "VTESSAI"));
  EXPECT_EQ(lignesAffichees(), (Lignes{"706300 | Essai du modèle | V10 | 10 | 0.00",
                                       "706000 | Pose | V55 | 5.5 | 0.00", "707100 | Export |  | 0 | 0.00"}));
  EXPECT_EQ(valeur("MIRVAE.NUMCP"), "411002");
  EXPECT_EQ(valeur("VLIBCP1"), "SCI Berthomieu");
  EXPECT_EQ(valeur("MIRVAE.NPIEC"), "M-12");
  EXPECT_EQ(valeur("MIRVAE.INPIE"), "Essai du modèle");
  // The lines carry the analytic codes of their accounts, as typed lines do.
  EXPECT_EQ(model::lignes(session())[0]["MIRVAL.CPOST"], "PROD");
}

TEST_F(ModelesTest, AModelOfAnotherJournalOrAnUnknownCodeIsRefused) {
  const struct {
    const char* code;
    const char* message;
  } cases[] = {
      {"VXEXPORT", "Le modèle doit être associé au n° journal <VT> !"},
      {"ACBOIS", "Le modèle doit être associé au n° journal <VT> !"},
      {"INCONNU", "Le modèle d'écriture est inexistant !"},
  };
  ASSERT_TRUE(creer());
  ASSERT_TRUE(client());
  ASSERT_TRUE(ligne("708500", "100"));
  for (const auto& c : cases) {
    SCOPED_TRACE(c.code);
    EXPECT_FALSE(saisir("V_CMODEL", c.code));
    EXPECT_EQ(dernierMessage(), c.message);
    EXPECT_EQ(valeur("V_CMODEL"), "");
    // The lines typed stay.
    ASSERT_EQ(model::lignes(session()).size(), 1u);
    EXPECT_EQ(model::lignes(session())[0]["MIRVAL.HT"], "100.00");
  }
  EXPECT_EQ(ecran().libelle("0415"), "Le modèle d'écriture est inexistant !");
}

TEST_F(ModelesTest, TheChoiceWindowAppliesThePickedModelAndACancelChangesNothing) {
  ASSERT_TRUE(creer());
  user_.ajouterChoix(std::nullopt);
  ASSERT_TRUE(appuyer("V_CMODEL_CHOISIR"));
  EXPECT_EQ(valeur("V_CMODEL"), "");
  EXPECT_TRUE(model::lignes(session()).empty());

  user_.ajouterChoix("VTPOSE");
  ASSERT_TRUE(appuyer("V_CMODEL_CHOISIR"));
  EXPECT_EQ(valeur("V_CMODEL"), "VTPOSE");
  EXPECT_EQ(model::lignes(session()).size(), 2u);
}

TEST_F(ModelesTest, TheNextPieceOfAChainStartsFromTheSameModel) {
  // Without analytics: the model's accounts would call the analytic screen.
  sql("UPDATE PARAM SET OPT_ANA = 0");
  ASSERT_TRUE(creer());
  ASSERT_TRUE(client());
  ASSERT_TRUE(saisir("V_CMODEL", "VTPOSE"));
  ASSERT_TRUE(model::allerLigne(session(), 1));
  ASSERT_TRUE(saisir("LST_V_HT", "400"));
  ASSERT_TRUE(model::validerLigne(session()));
  ASSERT_TRUE(model::allerLigne(session(), 2));
  ASSERT_TRUE(saisir("LST_V_HT", "250"));
  ASSERT_TRUE(model::validerLigne(session()));
  ASSERT_TRUE(enregistrer("2"));
  EXPECT_EQ(sql("SELECT HT || ' ' || TVA || ' ' || TTC FROM MIRVAE"), "650 130 780");

  EXPECT_EQ(ecran().modeCourant(), "C");
  EXPECT_EQ(valeur("V_CMODEL"), "VTPOSE");
  EXPECT_EQ(lignesAffichees(), (Lignes{"706000 | Pose et ajustage | V20 | 20 | 0.00",
                                       "707000 | Facture pose n° [PIECE] | V20 | 20 | 0.00"}));
}

// ---------------------------------------------------------------------------- duplication

class DuplicationTest : public Gestion1Test {
 protected:
  // The fixture's saved invoice turned into one in dollars at `rate`, of one line on
  // 706000 (00000500L1) with its analytic rows (credits).
  void operationEnDollars(const std::string& rate, const std::string& ht, const std::string& tva,
                          const std::vector<std::string>& analytic) {
    operationEnregistree("00000500");
    sql("UPDATE MIRVAE SET NUMCP = '411006', NPIEC = 'VT9', MONNAIE_IDENT = 'USD', COURS = " + rate);
    sql("DELETE FROM MIRVAL WHERE IDENT = '00000500L2'");
    sql("UPDATE MIRVAL SET NUMCP = '706000', LIBEC = 'Pose', CPOST = 'PROD', MOUVE_UNIQ = 77, HT = '" + ht +
        "', TVA = '" + tva + "', TTC = '" + (*host::Decimal::parse(ht) + *host::Decimal::parse(tva)).toString(0) + "'");
    const char* sections[] = {"ATELIER", "CHANTIER", "ADMIN"};
    for (std::size_t i = 0; i < analytic.size(); ++i)
      sql("INSERT INTO MIRVAANA (IDENT, NUMERO, CSECT, MTADE, MTACR) VALUES ('0000060" + std::to_string(i) +
          "', '00000500L1|', '" + sections[i] + "', '0', '" + analytic[i] + "')");
  }
};

TEST_F(DuplicationTest, ACopyAtTheNewRateScalesEveryAmountAndGetsNewIdentifiers) {
  const struct {
    const char* cas;
    const char* sourceRate;
    const char* ht;
    const char* tva;
    std::vector<std::string> analytic;
    const char* line;       // HT TVA TTC of the copy
    const char* rows;       // its analytic credits
  } cases[] = {
      // 110.50 / 1.105 × 1.2 = 120: every amount by 1.2 / 1.105.
      {"exact", "1.2", "110.5", "22.1", {"66.3", "44.2"}, "120 24 144", "72 48"},
      // 100 / 1.105 = 90.4977...: rounded to the cent, and the rows still make up
      // the line: the cent the rounding lost goes to the last row.
      {"arrondi", "1", "100", "20", {"33.33", "33.33", "33.34"}, "90.5 18.1 108.6", "30.18 30.16 30.16"},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.cas);
    sql("DELETE FROM MIRVAE");
    sql("DELETE FROM MIRVAL");
    sql("DELETE FROM MIRVAANA");
    operationEnDollars(c.sourceRate, c.ht, c.tva, c.analytic);
    ASSERT_TRUE(ouvrirFiche("00000500", "VMCAv"));
    ASSERT_TRUE(appuyer("CREAT2"));
    EXPECT_EQ(valeur("MIRVAE.MONNAIE_IDENT"), "USD");
    EXPECT_EQ(valeur("MIRVAE.COURS"), "1.105");
    EXPECT_EQ(valeur("COURS_ORIGINE"), c.sourceRate);
    ASSERT_EQ(model::lignes(session()).size(), 1u);
    ASSERT_TRUE(enregistrer("1"));

    std::string copy = sql("SELECT IDENT FROM MIRVAE WHERE IDENT <> '00000500'");
    ASSERT_FALSE(copy.empty());
    EXPECT_EQ(sql("SELECT COURS || ' ' || HT || ' ' || TVA || ' ' || TTC FROM MIRVAE WHERE IDENT = '" + copy + "'"),
              std::string("1.105 ") + c.line);
    std::string line = sql("SELECT IDENT FROM MIRVAL WHERE NUMERO LIKE '" + copy + "|%'");
    EXPECT_EQ(line.size(), 8u);
    EXPECT_NE(line, "00000500L1");
    EXPECT_EQ(sql("SELECT HT || ' ' || TVA || ' ' || TTC || ' ' || LIBEC || ' ' || CPOST FROM MIRVAL WHERE IDENT = '" +
                  line + "'"),
              std::string(c.line) + " Pose PROD");
    EXPECT_EQ(sql("SELECT group_concat(MTACR, ' ') FROM (SELECT MTACR FROM MIRVAANA WHERE NUMERO = '" + line +
                  "|' ORDER BY CSECT)"),
              c.rows);
    EXPECT_EQ(nombre("SELECT count(*) FROM MIRVAANA WHERE NUMERO = '" + line +
                     "|' AND IDENT IN (SELECT IDENT FROM MIRVAANA WHERE NUMERO = '00000500L1|')"),
              0);
    EXPECT_EQ(nombre("SELECT count(DISTINCT IDENT) FROM MIRVAANA WHERE NUMERO = '" + line + "|'"),
              static_cast<long long>(c.analytic.size()));
    // The source keeps its own.
    EXPECT_EQ(sql("SELECT HT FROM MIRVAL WHERE IDENT = '00000500L1'"), c.ht);
    EXPECT_EQ(nombre("SELECT count(*) FROM MIRVAANA WHERE NUMERO = '00000500L1|'"),
              static_cast<long long>(c.analytic.size()));
    model::fermer(session());
  }
}

}  // namespace
