// The currency of a client invoice: a change of currency converts the lines once the
// user confirmed it, a fixed rate cannot be typed, a typed rate converts nothing, a
// saved operation keeps its rate, and no change is made in visualisation or while a
// line is being typed. Amounts show and are typed with their currency's decimals.
#include <gtest/gtest.h>

#include <functional>
#include <sstream>

#include "app/exports.h"
#include "host/currency.h"
#include "tests/entry/gestion1_fixture.h"

namespace {

using testing_support::Gestion1Test;

constexpr const char* kQuestion = "Confirmez-vous le changement de devise et le recalcul de la pièce ?";

class DevisesTest : public Gestion1Test {
 protected:

  // HT TVA TTC of each line, then the totals, as shown.
  std::string montants() {
    std::string out;
    for (auto& row : model::lignes(session()))
      out += row["MIRVAL.HT"] + " " + row["MIRVAL.TVA"] + " " + row["MIRVAL.TTC"] + " / ";
    return out + valeur("V_TOT_HT") + " " + valeur("V_TOT_TVA") + " " + valeur("V_TOT_TTC");
  }
  std::size_t questions() { return session().transcript().textes("question").size(); }
};

TEST_F(DevisesTest, ChangingTheCurrencyOfADocumentWithLinesAsksThenConvertsOrKeepsEverything) {
  const struct {
    const char* cas;
    const char* currency;
    bool yes;
    const char* shown;  // currency and rate afterwards
    const char* amounts;
  } cases[] = {
      // 15/03/2024: 1.105 dollars, 156.33 yen for one euro.
      {"dollars", "USD", true, "USD 1.105", "110.50 22.10 132.60 / 55.25 0.00 55.25 / 165.75 22.10 187.85"},
      // No decimals in yen: 3126.6 and 7816.5 round to the nearest, halves away from zero,
      // and the amounts show none.
      {"yens", "JPY", true, "JPY 156.33", "15633 3127 18760 / 7817 0 7817 / 23450 3127 26577"},
      {"refusé", "USD", false, "EUR 1", "100.00 20.00 120.00 / 50.00 0.00 50.00 / 150.00 20.00 170.00"},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.cas);
    ASSERT_TRUE(facture());
    std::size_t before = questions();
    user_.ajouterOui(c.yes);
    EXPECT_EQ(saisir("MIRVAE.MONNAIE_IDENT", c.currency), c.yes);
    ASSERT_EQ(questions(), before + 1);
    EXPECT_EQ(session().transcript().textes("question").back(), kQuestion);
    EXPECT_EQ(valeur("MIRVAE.MONNAIE_IDENT") + " " + valeur("MIRVAE.COURS"), c.shown);
    EXPECT_EQ(host::euro().courante(), std::string(c.shown).substr(0, 3));
    EXPECT_EQ(montants(), c.amounts);
    model::fermer(session());
  }
}

TEST_F(DevisesTest, TheChoiceWindowChangesTheCurrencyOfAnEmptyDocumentAndACancelKeepsIt) {
  ASSERT_TRUE(creer());
  user_.ajouterChoix(std::nullopt);
  EXPECT_FALSE(appuyer("MONNAIE_CHOISIR"));
  EXPECT_EQ(valeur("MIRVAE.MONNAIE_IDENT"), "EUR");
  user_.ajouterChoix("USD");
  EXPECT_TRUE(appuyer("MONNAIE_CHOISIR"));
  EXPECT_EQ(valeur("MIRVAE.MONNAIE_IDENT") + " " + valeur("MIRVAE.COURS"), "USD 1.105");
  // Without lines there is nothing to recompute, so nothing to confirm.
  EXPECT_EQ(questions(), 0u);
}

TEST_F(DevisesTest, EachCurrencyTakesItsRateAFixedOneCannotBeTypedAndNoneIsRefused) {
  const struct {
    const char* currency;
    const char* rate;
    bool fixed;
  } cases[] = {{"EUR", "1", true},       {"FRF", "6.55957", true}, {"XPF", "119.331742", true},
               {"USD", "1.105", false},  {"JPY", "156.33", false}};
  ASSERT_TRUE(creer());
  for (const auto& c : cases) {
    SCOPED_TRACE(c.currency);
    ASSERT_TRUE(saisir("MIRVAE.MONNAIE_IDENT", c.currency));
    EXPECT_EQ(valeur("MIRVAE.COURS"), c.rate);
    EXPECT_EQ(ecran().ecran()->estInterdit("COURS"), c.fixed);
    EXPECT_EQ(saisir("MIRVAE.COURS", "2"), !c.fixed);
  }
  EXPECT_FALSE(saisir("MIRVAE.MONNAIE_IDENT", ""));
  EXPECT_EQ(dernierMessage(), "La saisie d'une monnaie est obligatoire !");
  EXPECT_EQ(valeur("MIRVAE.MONNAIE_IDENT"), "JPY");
}

// A rate typed by hand stays the document's and leaves its amounts as they are: they
// are in dollars whatever the rate.
TEST_F(DevisesTest, ATypedRateConvertsNothing) {
  user_.ajouterOui(true);
  ASSERT_TRUE(facture());
  ASSERT_TRUE(saisir("MIRVAE.MONNAIE_IDENT", "USD"));
  ASSERT_TRUE(saisir("MIRVAE.COURS", "1.25"));
  EXPECT_EQ(valeur("MIRVAE.COURS"), "1.25");
  EXPECT_EQ(montants(), "110.50 22.10 132.60 / 55.25 0.00 55.25 / 165.75 22.10 187.85");
  ASSERT_TRUE(enregistrer("1"));
  EXPECT_EQ(sql("SELECT MONNAIE_IDENT || ' ' || COURS || ' ' || HT FROM MIRVAE"), "USD 1.25 165.75");
}

TEST_F(DevisesTest, ASavedOperationOpensAtItsOwnRate) {
  operationEnregistree("00000971");
  sql("UPDATE MIRVAE SET MONNAIE_IDENT = 'USD', COURS = 1.3 WHERE IDENT = '00000971'");
  ASSERT_TRUE(ouvrirFiche("00000971", "VMCAv"));
  EXPECT_EQ(valeur("MIRVAE.MONNAIE_IDENT") + " " + valeur("MIRVAE.COURS"), "USD 1.3");
  EXPECT_EQ(host::euro().courante(), "USD");
  EXPECT_EQ(montants(), "100.00 20.00 120.00 / 50.00 0.00 50.00 / 150.00 20.00 170.00");
}

TEST_F(DevisesTest, AConvertedModificationSavesItsAnalyticRowsInTheNewCurrency) {
  operationEnregistree("00000981");
  sql("INSERT INTO MIRVAANA (IDENT, NUMERO, CSECT, MTADE, MTACR) VALUES ('00000991', '00000981L1|', 'ATELIER', "
      "'0', '60'), ('00000992', '00000981L1|', 'CHANTIER', '0', '40')");
  ASSERT_TRUE(ouvrirFiche("00000981", "VMCAm"));
  ASSERT_EQ(ecran().modeCourant(), "M");
  user_.ajouterOui(true);
  ASSERT_TRUE(saisir("MIRVAE.MONNAIE_IDENT", "USD"));
  ASSERT_TRUE(appuyer("B_VALID_DOC"));
  EXPECT_EQ(sql("SELECT MONNAIE_IDENT || ' ' || COURS || ' ' || HT || ' ' || TVA || ' ' || TTC FROM MIRVAE"),
            "USD 1.105 165.75 22.1 187.85");
  EXPECT_EQ(sql("SELECT group_concat(MTACR, ' ') FROM (SELECT MTACR FROM MIRVAANA ORDER BY CSECT)"), "66.3 44.2");
}

// 0.25 from rate 3 to rate 1.5 is exactly 0.125: whichever road moves it between the
// two rates, it lands on the same cent, the half rounded away from zero.
TEST_F(DevisesTest, OneRepricingGivesTheSameCentOnEveryRoad) {
  // Pounds kept at 1.5 for one euro, dollars at 3.
  sql("INSERT INTO MONNAIE (IDENT, LIBELLE, DECIMALES, ZONE_EURO, COURS_FIXE) VALUES ('GBP', 'Livre', 2, 'N', 0)");
  sql("INSERT INTO MONNAIE_COURS (IDENT, DTCOURS, COURS) VALUES ('GBP', '2024-03-01', 1.5), ('USD', '2024-03-01', 3)");
  sql("UPDATE PARAM SET MONNAIE_IDENT = 'GBP'");
  // A client invoice in dollars with one line of 0.25 without VAT.
  auto enDollars = [&] {
    return creer() && saisir("MIRVAE.MONNAIE_IDENT", "USD") && client() && ligne("758000", "0.25");
  };
  const struct {
    const char* road;
    std::function<std::string()> play;  // the amount that the road re-priced
  } roads[] = {
      {"copie d'une opération saisie à 1.5, au cours du jour 3",
       [&] {
         operationEnregistree("00000951");
         sql("UPDATE MIRVAE SET MONNAIE_IDENT = 'USD', COURS = 1.5 WHERE IDENT = '00000951'");
         sql("DELETE FROM MIRVAL WHERE IDENT = '00000951L1'");
         sql("UPDATE MIRVAL SET HT = '0.25', TTC = '0.25' WHERE IDENT = '00000951L2'");
         if (!ouvrirFiche("00000951", "VMCAv") || !appuyer("CREAT2")) return std::string("copie refusée");
         return model::lignes(session())[0]["MIRVAL.HT"];
       }},
      {"bascule des dollars à 3 en livres à 1.5",
       [&] {
         user_.ajouterOui(true);
         if (!enDollars() || !saisir("MIRVAE.MONNAIE_IDENT", "GBP")) return std::string("bascule refusée");
         return model::lignes(session())[0]["MIRVAL.HT"];
       }},
      {"pièce en dollars à 3 valorisée en livres à 1.5",
       [&] {
         if (!enDollars() || !enregistrer("1")) return std::string("pièce refusée");
         return sql("SELECT MTCRE FROM MOUVE WHERE NUMCP = '758000'");
       }},
  };
  for (const auto& r : roads) {
    SCOPED_TRACE(r.road);
    EXPECT_EQ(r.play(), "0.13");
    model::fermer(session());
  }
}

TEST_F(DevisesTest, NoChangeInVisualisationNorWhileALineIsTyped) {
  operationEnregistree("00000961");
  ASSERT_TRUE(ouvrirFiche("00000961", "VMCAv"));
  EXPECT_TRUE(appuyer("MONNAIE_CHOISIR"));
  EXPECT_EQ(dernierMessage(), "Opération interdite en mode visualisation !");
  EXPECT_FALSE(saisir("MIRVAE.MONNAIE_IDENT", "USD"));
  EXPECT_EQ(valeur("MIRVAE.MONNAIE_IDENT"), "EUR");
  model::fermer(session());

  ASSERT_TRUE(facture());
  ASSERT_TRUE(ligne("706300", "30", "-", false));
  ASSERT_TRUE(ecran().lineInEntry());
  EXPECT_TRUE(appuyer("MONNAIE_CHOISIR"));
  EXPECT_EQ(dernierMessage(), "Le changement de devise est interdit en cours de saisie de ligne !");
  // Typed over, the currency is refused without a question and the amounts stay.
  EXPECT_FALSE(saisir("MIRVAE.MONNAIE_IDENT", "USD"));
  EXPECT_EQ(questions(), 0u);
  EXPECT_EQ(valeur("MIRVAE.MONNAIE_IDENT") + " " + host::euro().courante(), "EUR EUR");
  EXPECT_EQ(model::lignes(session())[0]["MIRVAL.HT"], "100.00");
}

TEST_F(DevisesTest, ATypedAmountTakesTheDecimalsOfItsCurrencyAndOneTooLargeIsRefused) {
  const struct {
    const char* currency;
    const char* typed;
    const char* shown;  // "" when refused
  } cases[] = {
      {"EUR", "0.005", "0.01"},    {"EUR", "-0.005", "-0.01"},   {"EUR", "0.0049", "0.00"},
      {"EUR", "1500", "1500.00"},  {"JPY", "1500", "1500"},      {"JPY", "1000.5", "1001"},
      {"XPF", "0.49", "0"},        {"EUR", "999999999999999.99", "999999999999999.99"},
      {"EUR", "1000000000000000", ""},
      {"EUR", "12345678901234567890123456789012345678", ""},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(std::string(c.currency) + " " + c.typed);
    ASSERT_TRUE(creer());
    ASSERT_TRUE(saisir("MIRVAE.MONNAIE_IDENT", c.currency));
    ASSERT_TRUE(client());
    ASSERT_TRUE(model::nouvelleLigne(session()));
    ASSERT_TRUE(saisir("LST_MIRVAL.NUMCP", "758000"));
    bool accepted = *c.shown != 0;
    EXPECT_EQ(saisir("LST_V_HT", c.typed), accepted);
    if (accepted) {
      // What the line keeps is what the screen shows and the transcript recorded.
      EXPECT_EQ(valeur("LST_V_HT"), c.shown);
      EXPECT_EQ(valeur("LST_MIRVAL.HT"), c.shown);
      EXPECT_EQ(session().transcript().textes("saisie").back(), std::string("LST_V_HT = ") + c.shown);
    } else {
      EXPECT_NE(dernierMessage().find("est trop grand : 15 chiffres au plus avant la virgule"), std::string::npos)
          << dernierMessage();
      EXPECT_LT(dernierMessage().size(), 200u);
    }
    model::fermer(session());
  }
}

TEST_F(DevisesTest, TheLedgerListingAndTheExportShowTheDecimalsOfTheKeepingCurrency) {
  sql("UPDATE PARAM SET MONNAIE_IDENT = 'XPF'");
  base().exec(
      "INSERT INTO PIECE (NPIES, NPIEC, NUMJL, DTOPE, INPIE, MONNAIE_IDENT) VALUES "
      "('00000000001', 'VT1', 'VT', '2024-03-15', 'Facture', 'XPF');"
      "INSERT INTO MOUVE (NPIES, NLIGS, NUMCP, LIBEC, MTDEB, MTCRE) VALUES "
      "('00000000001', '1', '411001', 'Facture', '1794', '0'), ('00000000001', '2', '706300', 'Facture', '0', '1794');"
      "INSERT INTO ECHEA (NUSYS, NPIES, DTECH, MTECH) VALUES ('1', '00000000001', '2024-03-15', '1794')");
  std::ostringstream listing, hledger;
  app::imprimerGrandLivre(base(), listing);
  app::exporterHledger(base(), hledger);
  EXPECT_NE(listing.str().find("échéance du 2024-03-15 : 1794, ouverte\n"), std::string::npos) << listing.str();
  EXPECT_NE(listing.str().find("débit 1794 XPF, crédit 1794 XPF"), std::string::npos) << listing.str();
  EXPECT_NE(hledger.str().find("411001    1794 XPF"), std::string::npos) << hledger.str();
  EXPECT_EQ(listing.str().find("1794.00"), std::string::npos) << listing.str();
}

}  // namespace
