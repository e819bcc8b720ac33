// Lines of a client invoice: the amounts computed from the one typed, VAT rates from
// the history, line checks, VAT management off, and the totals.
#include <gtest/gtest.h>

#include "tests/entry/gestion1_fixture.h"

namespace {

using testing_support::Gestion1Test;

// What the entry screen handed the analytic screen, one launch a text of its
// parameters joined by "|".
std::vector<std::string> analyticLaunches;

// Stands in for the analytic screen: records its launch and returns at once.
struct AnalyticScreen : model::Traitmnt {
  explicit AnalyticScreen(host::Evt* e) : Traitmnt(e) {
    std::string params;
    for (int i = 0; i < e->nbParams(); ++i) params += (i ? "|" : "") + e->parametre(i).chaine();
    analyticLaunches.push_back(params);
  }
};

class LignesTest : public Gestion1Test {
 protected:
  void SetUp() override {
    Gestion1Test::SetUp();
    analyticLaunches.clear();
    // A code of the old normal rate, still in force, to compute at 19.6 %.
    sql("INSERT INTO CDTVA (COTVA, LIBELLE, TYTVA, CITVA, CETVA) VALUES ('V196', 'Ancien taux', 'V', '445711', "
        "'445800')");
    sql("INSERT INTO HISTVA (COTVA, DTDEB, TXTVA) VALUES ('V196', '1990-01-01', 19.6)");
  }
  testing_support::ModuleStandIn analytic_{"MIRVAE-GEST_ANA", &host::fabriquer<AnalyticScreen>};
};

struct Montants {
  const char* cas;
  const char* saisieMtt;
  const char* account;
  const char* vatCode;  // "-": the account's own
  const char* typed;
  const char* ht;
  const char* tva;
  const char* ttc;
};

TEST_F(LignesTest, TheTypedAmountGivesTheOtherTwoWithOnlyTheVatRounded) {
  const Montants cases[] = {
      {"hors taxe à 19,6 %", "1", "708500", "V196", "100", "100.00", "19.60", "119.60"},
      {"toutes taxes à 19,6 %", "2", "708500", "V196", "119.60", "100.00", "19.60", "119.60"},
      {"demi-centime arrondi au plus près", "1", "708500", "V10", "1.15", "1.15", "0.12", "1.27"},
      {"avoir : arrondi en s'éloignant de zéro", "1", "708500", "V10", "-1.15", "-1.15", "-0.12", "-1.27"},
      {"taux nul", "1", "758000", "-", "250.5", "250.50", "0.00", "250.50"},
      {"toutes taxes à 20 %, TVA arrondie", "2", "708500", "-", "10", "8.33", "1.67", "10.00"},
  };
  for (const Montants& c : cases) {
    SCOPED_TRACE(c.cas);
    ASSERT_TRUE(creer());
    ASSERT_TRUE(saisir("MIRVAE.SAISIE_MTT", c.saisieMtt));
    ASSERT_TRUE(client());
    ASSERT_TRUE(ligne(c.account, c.typed, c.vatCode, false));
    EXPECT_EQ(valeur("LST_MIRVAL.HT"), c.ht);
    EXPECT_EQ(valeur("LST_MIRVAL.TVA"), c.tva);
    EXPECT_EQ(valeur("LST_MIRVAL.TTC"), c.ttc);
    // The other column shows the amount not typed.
    EXPECT_EQ(valeur("LST_V_TTC"), std::string(c.saisieMtt) == "1" ? c.ttc : c.ht);
    model::fermer(session());
  }
}

TEST_F(LignesTest, IncludingTaxSwapsTheColumnCaptionsAndEveryLineAtOnce) {
  ASSERT_TRUE(creer());
  EXPECT_EQ(ecran().ecran()->titreDe("LST_V_HT"), "Mtt HT");
  EXPECT_EQ(ecran().ecran()->titreDe("LST_V_TTC"), "Mtt TTC");
  ASSERT_TRUE(client());
  ASSERT_TRUE(ligne("708500", "100"));
  ASSERT_TRUE(ligne("758000", "50"));
  ASSERT_TRUE(model::allerLigne(session(), 2));
  ASSERT_TRUE(saisir("MIRVAE.SAISIE_MTT", "2"));
  EXPECT_EQ(ecran().ecran()->titreDe("LST_V_HT"), "Mtt TTC");
  EXPECT_EQ(ecran().ecran()->titreDe("LST_V_TTC"), "Mtt HT");
  EXPECT_EQ(valeur("V_SAISIE_MTT"), "TTC");
  // Every line shows its amounts in the new mode, not only the one gone back to.
  std::string shown;
  for (auto& row : model::lignes(session())) shown += row["V_HT"] + " " + row["V_TTC"] + " / ";
  EXPECT_EQ(shown, "120.00 100.00 / 50.00 50.00 / ");
  // The current line is still the one the user is on.
  EXPECT_EQ(valeur("LST_MIRVAL.NUMCP") + " " + valeur("VLIBCP2"),
            "758000 " + sql("SELECT LIBCP FROM COMPT WHERE NUMCP = '758000'"));
}

TEST_F(LignesTest, AnUnknownVatCodeIsRefusedAndAnOvertypedVatIsKept) {
  ASSERT_TRUE(creer());
  ASSERT_TRUE(client());
  ASSERT_TRUE(ligne("708500", "100", "-", false));
  EXPECT_FALSE(saisir("LST_MIRVAL.COTVA", "X99"));
  EXPECT_EQ(dernierMessage(), "Le code TVA est inexistant !");
  EXPECT_EQ(valeur("LST_MIRVAL.COTVA"), "V20");
  ASSERT_TRUE(saisir("LST_MIRVAL.TVA", "19.99"));
  EXPECT_EQ(valeur("LST_MIRVAL.HT"), "100.00");
  EXPECT_EQ(valeur("LST_MIRVAL.TVA"), "19.99");
  EXPECT_EQ(valeur("LST_MIRVAL.TTC"), "119.99");

  ASSERT_TRUE(saisir("MIRVAE.SAISIE_MTT", "2"));
  ASSERT_TRUE(saisir("LST_V_HT", "120"));
  EXPECT_EQ(valeur("LST_MIRVAL.TVA"), "20.00");
  ASSERT_TRUE(saisir("LST_MIRVAL.TVA", "19.99"));
  EXPECT_EQ(valeur("LST_MIRVAL.TTC"), "120.00");
  EXPECT_EQ(valeur("LST_MIRVAL.HT"), "100.01");
}

// The rate of the code on the operation date, not on today's (20 %).
TEST_F(LignesTest, TheRateIsTheOneInForceOnTheOperationDate) {
  // An exercise opened in 2013, so that a date before the rate change may be typed.
  sql("UPDATE PARAM SET PDDEX = '2013-01-01'");
  ASSERT_TRUE(creer());
  ASSERT_TRUE(saisir("MIRVAE.DTOPE", "31/12/2013"));
  ASSERT_TRUE(client());
  ASSERT_TRUE(ligne("708500", "100", "-", false));
  EXPECT_EQ(valeur("LST_MIRVAL.COTVA"), "V20");
  EXPECT_EQ(valeur("LST_MIRVAL.TXTVA"), "19.6");
  EXPECT_EQ(valeur("LST_MIRVAL.TVA"), "19.60");
}

TEST_F(LignesTest, LineChecksRefuseTheLineInTheirOrder) {
  const struct {
    const char* cas;
    const char* account;
    const char* amount;
    const char* overtypedVat;
    const char* message;
    const char* focus;
  } cases[] = {
      {"sans compte", "", "100", nullptr, "La saisie d'un compte produit est obligatoire !", "LST_VLIBCP2"},
      {"sans montant", "708500", "0", nullptr, "La saisie d'un montant HT est obligatoire !", "LST_V_HT"},
      {"TVA sans code", "758000", "100", "5", "La saisie d'un code TVA est obligatoire !", "LST_MIRVAL.COTVA"},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.cas);
    ASSERT_TRUE(creer());
    ASSERT_TRUE(client());
    ASSERT_TRUE(ligne(c.account, c.amount, "-", false));
    if (c.overtypedVat) {
      ASSERT_TRUE(saisir("LST_MIRVAL.TVA", c.overtypedVat));
    }
    EXPECT_FALSE(model::validerLigne(session()));
    EXPECT_EQ(dernierMessage(), c.message);
    EXPECT_EQ(ecran().ecran()->focus(), c.focus);
    EXPECT_TRUE(model::lignes(session()).empty());
    model::fermer(session());
  }
}

TEST_F(LignesTest, WithoutVatManagementLinesCarryNoVatAndItsColumnsAreForbidden) {
  sql("UPDATE PARAM SET OPT_TVA = 0");
  ASSERT_TRUE(creer());
  for (const char* control : {"LST_MIRVAL.COTVA", "LST_MIRVAL.TVA", "CDTVA_CHOISIR"})
    EXPECT_TRUE(ecran().ecran()->estInterdit(control)) << control;
  ASSERT_TRUE(client());
  ASSERT_TRUE(ligne("708500", "100", "-", false));
  EXPECT_EQ(valeur("LST_MIRVAL.COTVA"), "");
  EXPECT_EQ(valeur("LST_MIRVAL.TXTVA"), "0");
  EXPECT_EQ(valeur("LST_MIRVAL.TTC"), "100.00");
  EXPECT_FALSE(saisir("LST_MIRVAL.COTVA", "V20"));
  EXPECT_FALSE(saisir("LST_MIRVAL.TVA", "20"));
  // Named without the list, or through its choice window, the column is as out of reach.
  EXPECT_FALSE(saisir("MIRVAL.COTVA", "V20"));
  EXPECT_FALSE(model::ouvrirChoix(session(), "LST_MIRVAL.COTVA"));
  EXPECT_EQ(valeur("LST_MIRVAL.COTVA"), "");
}

TEST_F(LignesTest, TotalsFollowTheLinesAndFallBackToTheSavedOnes) {
  ASSERT_TRUE(creer());
  ASSERT_TRUE(client());
  ASSERT_TRUE(ligne("708500", "100"));
  ASSERT_TRUE(ligne("758000", "50"));
  EXPECT_EQ(valeur("V_TOT_HT"), "150.00");
  EXPECT_EQ(valeur("V_TOT_TVA"), "20.00");
  EXPECT_EQ(valeur("V_TOT_TTC"), "170.00");
  ASSERT_TRUE(model::allerLigne(session(), 2));
  ASSERT_TRUE(model::supprimerLigne(session()));
  EXPECT_EQ(valeur("V_TOT_TTC"), "120.00");
  model::fermer(session());

  // With no line in memory, the totals are those of the lines saved for the header.
  operationEnregistree("00000901");
  ASSERT_TRUE(ouvrirFiche("00000901", "VMCAv"));
  EXPECT_EQ(valeur("V_TOT_TTC"), "170.00");
  host::Table& memoire = *ecran().tableNommee("MEM_MIRVAL");
  ASSERT_TRUE(session().action([&] {
    memoire.initRequete();
    memoire.vide();
    ecran().variable("V_TOT_TTC")->affecterTexte("0");
    ecran().executer("CALCUL_TOTAUX", nullptr);
  }));
  EXPECT_EQ(valeur("V_TOT_HT"), "150.00");
  EXPECT_EQ(valeur("V_TOT_TVA"), "20.00");
  EXPECT_EQ(valeur("V_TOT_TTC"), "170.00");
}

TEST_F(LignesTest, AnalyticBreakdownIsAskedOnlyForAnAccountThatTakesIt) {
  // Revenue accounts of nature "Q" take analytics: on going back to such a line, the
  // button opens the analytic screen.
  ASSERT_TRUE(creer());
  ASSERT_TRUE(client());
  ASSERT_TRUE(ligne("708500", "100"));
  ASSERT_TRUE(ligne("706000", "100"));
  ASSERT_TRUE(model::allerLigne(session(), 1));
  EXPECT_EQ(valeur("ANA_O_N"), "0");
  EXPECT_TRUE(ecran().ecran()->estInterdit("BT_ANALYTIQUE"));
  ASSERT_TRUE(saisir("LST_V_HT", "110"));
  EXPECT_TRUE(model::validerLigne(session()));

  ASSERT_TRUE(model::allerLigne(session(), 2));
  EXPECT_EQ(valeur("ANA_O_N"), "1");
  EXPECT_FALSE(ecran().ecran()->estInterdit("BT_ANALYTIQUE"));
  EXPECT_TRUE(analyticLaunches.empty());
  EXPECT_TRUE(appuyer("BT_ANALYTIQUE"));
  EXPECT_EQ(analyticLaunches.size(), 1u);
}

TEST_F(LignesTest, TheAnalyticScreenGetsTheLineOnTheSideOfItsMovement) {
  sql("UPDATE COMPT SET CPOST = 'PROD', CCRIT = 'ATEL', CSECT = 'ATELIER', SAANA = 'O' "
      "WHERE NUMCP IN ('706000', '601000')");
  // Revenue stands on the credit, expenses on the debit; a negative line, on the other side.
  const struct {
    int kind;
    const char* header;
    const char* account;
    const char* saisieMtt;
    const char* typed;
    const char* debitCreditSign;  // of the amount excluding tax, whichever was typed
  } cases[] = {
      {1, "Brasserie Lissandre", "706000", "1", "100", "0.00|100.00|1"},
      {1, "Brasserie Lissandre", "706000", "1", "-100", "100.00|0.00|-1"},
      {1, "Brasserie Lissandre", "706000", "2", "120", "0.00|100.00|1"},
      {1, "Brasserie Lissandre", "706000", "2", "-120", "100.00|0.00|-1"},
      {2, "Scierie Maurel Frères", "601000", "1", "100", "100.00|0.00|1"},
      {2, "Scierie Maurel Frères", "601000", "1", "-100", "0.00|100.00|-1"},
      {3, "Bonnefon Lucas", "601000", "2", "120", "100.00|0.00|1"},
      {3, "Bonnefon Lucas", "601000", "1", "-100", "0.00|100.00|-1"},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(std::to_string(c.kind) + " " + c.saisieMtt + " " + c.typed);
    kind_ = c.kind;
    ASSERT_TRUE(creer());
    ASSERT_TRUE(saisir("MIRVAE.SAISIE_MTT", c.saisieMtt));
    ASSERT_TRUE(client(c.header));
    ASSERT_TRUE(ligne(c.account, c.typed, c.kind == 1 ? "V20" : "A20"));
    ASSERT_TRUE(model::allerLigne(session(), 1));
    analyticLaunches.clear();
    ASSERT_TRUE(appuyer("BT_ANALYTIQUE"));
    ASSERT_EQ(analyticLaunches.size(), 1u);
    EXPECT_EQ(analyticLaunches[0], valeur("LST_MIRVAL.IDENT") + "|VMm|15/03/2024|1|PROD|ATEL|ATELIER|" +
                                       c.debitCreditSign + "|O");
    model::fermer(session());
  }
}

}  // namespace
