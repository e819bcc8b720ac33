#include "host/currency.h"

#include <gtest/gtest.h>

#include "host/automate.h"
#include "host/error.h"
#include "host/table.h"
#include "tests/support/fixture.h"

namespace {

using namespace host;

Jour jour(const char* text) { return *lireJour(text); }
Decimal dec(const char* text) { return *Decimal::parse(text); }
std::string txt(const Decimal& d) { return d.toString(0); }

using CurrencyTest = testing_support::DossierTest;

TEST(AmountText, FrenchFormGroupsThousandsAndKeepsTheCurrencysDecimals) {
  const struct {
    const char* amount;
    int decimals;
    const char* shown;
  } cases[] = {{"0", 2, "0,00"},          {"999.5", 2, "999,50"},          {"1234.565", 2, "1 234,57"},
               {"-1234567.8", 2, "-1 234 567,80"}, {"-100", 2, "-100,00"}, {"1500", 0, "1 500"},
               {"123456.7891", 3, "123 456,789"}};
  for (const auto& c : cases) EXPECT_EQ(frenchAmountText(dec(c.amount), c.decimals), c.shown) << c.amount;
}

TEST_F(CurrencyTest, RateIsTheLatestOnOrBeforeTheDay) {
  struct Case {
    const char* ident;
    const char* day;
    const char* rate;
  };
  for (Case c : {Case{"USD", "15/03/2024", "1.105"}, Case{"USD", "30/06/2024", "1.105"},
                 Case{"USD", "01/07/2024", "1.0705"}, Case{"JPY", "31/12/2013", "129.39"},
                 Case{"EUR", "01/01/1990", "1"}, Case{"FRF", "01/01/1990", "6.55957"}}) {
    EXPECT_EQ(txt(euro().cours(c.ident, jour(c.day))), c.rate) << c.ident << " " << c.day;
  }
  // An empty day is today (15/03/2024 in the tests).
  EXPECT_EQ(txt(euro().cours("USD", Jour())), "1.105");
  try {
    euro().cours("USD", jour("01/01/2000"));
    FAIL();
  } catch (const HostError& e) {
    EXPECT_NE(std::string(e.what()).find("« USD »"), std::string::npos) << e.what();
  }
}

TEST_F(CurrencyTest, ConvertsThroughTheReferenceExactly) {
  Jour day = jour("15/03/2024");
  EXPECT_EQ(txt(euro().convertir(dec("100"), "EUR", "USD", day)), "110.5");
  EXPECT_EQ(txt(euro().convertir(dec("110.5"), "USD", "EUR", day)), "100");
  EXPECT_EQ(txt(euro().arrondir(euro().convertir(dec("1000"), "FRF", "EUR", day), "EUR")), "152.45");
  // 100 × 156.33 / 1.105 = 14147.51...: no decimals in yen.
  EXPECT_EQ(txt(euro().arrondir(euro().convertir(dec("100"), "USD", "JPY", day), "JPY")), "14148");
  EXPECT_EQ(txt(euro().arrondir(dec("0.125"), "EUR")), "0.13");
}

TEST_F(CurrencyTest, UnknownCurrencyIsNamedInTheError) {
  for (auto call : std::vector<std::function<void()>>{
           [] { euro().decimales("XYZ"); }, [] { euro().estReference("XYZ"); },
           [] { euro().convertir(dec("1"), "EUR", "XYZ", Jour()); },
           [] { euro().definirCourante("XYZ", Jour()); }, [] { euro().definirBascule("EUR", "XYZ"); }}) {
    try {
      call();
      ADD_FAILURE() << "no error";
    } catch (const HostError& e) {
      EXPECT_NE(std::string(e.what()).find("« XYZ »"), std::string::npos) << e.what();
    }
  }
}

TEST_F(CurrencyTest, TypedRateHoldsForItsDayAndNotForFixedCurrencies) {
  euro().saisirCours("USD", jour("15/03/2024"), dec("1.2"));
  EXPECT_EQ(txt(euro().cours("USD", jour("15/03/2024"))), "1.2");
  EXPECT_EQ(txt(euro().cours("USD", jour("16/03/2024"))), "1.105");
  EXPECT_THROW(euro().saisirCours("FRF", jour("15/03/2024"), dec("7")), HostError);
  EXPECT_THROW(euro().saisirCours("USD", jour("15/03/2024"), dec("0")), HostError);
}

TEST_F(CurrencyTest, CurrentCurrencyAndItsConversions) {
  EXPECT_EQ(euro().courante(), "EUR");
  EXPECT_EQ(txt(euro().coursCourant()), "1");
  euro().definirCourante("USD", jour("15/03/2024"));
  EXPECT_EQ(euro().courante(), "USD");
  EXPECT_EQ(txt(euro().coursCourant()), "1.105");
  euro().definirCourante("USD", jour("15/03/2024"), dec("1.25"));
  EXPECT_EQ(txt(euro().coursCourant()), "1.25");
  EXPECT_THROW(euro().definirCourante("FRF", jour("15/03/2024"), dec("7")), HostError);

  // The screens' form: an amount of the keeping currency in the current one and back.
  Monnaie amount(dec("100"));
  EXPECT_EQ(txt(euro().conversion(amount, 0, Date(), Double(0))), "125");
  Monnaie back(dec("125"));
  EXPECT_EQ(txt(euro().conversion(back, 1, Date(), Double(0))), "100");
  Double rate(2);
  EXPECT_EQ(txt(euro().conversion(amount, 0, Date(), rate)), "200");

  euro().definirBascule("USD", "EUR");
  EXPECT_EQ(euro().source(), "USD");
  EXPECT_EQ(euro().cible(), "EUR");
}

TEST_F(CurrencyTest, EachSessionHasItsOwnCurrentCurrency) {
  euro().definirCourante("JPY", jour("15/03/2024"));
  rouvrir();
  EXPECT_EQ(euro().courante(), "EUR");
}

// ---------------------------------------------------------------------------- the currency switch

// A document with two lines in its memory image; its "CTRL_ACTUALISER_MODE" makes the
// asked currency current unless told to refuse, as a screen does.
struct Document : Automate {
  explicit Document(bool refuse) : Automate(nullptr) {
    addBranch("CTRL_ACTUALISER_MODE", [this, refuse](Evt* e) {
      if (refuse) return erreurMethode(1, e);
      euro().definirCourante(e->parametre(0).chaine(), e->parametre(1).jour());
      erreurMethode(0, e);
    });
    addBranch("CTRL_ACTUALISER_BASCULE", [this](Evt*) { ++refreshed; });
  }
  void ligne(const char* numero, const char* ht, const char* tva) {
    lines.raz();
    lines.affecter("NUMERO", Valeur::texte(numero));
    lines.affecter("NUMCP", Valeur::texte("708500"));
    lines.affecter("HT", Valeur::montant(dec(ht)));
    lines.affecter("TVA", Valeur::montant(dec(tva)));
    lines.ecrit();
  }
  std::string montants() {
    std::string out;
    lines.initRequete();
    lines.activeRequete();
    for (int rc = lines.suivant(3); rc == 0; rc = lines.suivant(1))
      out += lines.valeur("NUMCP").chaine() + " " + lines.valeur("HT").chaine() + " " + lines.valeur("TVA").chaine() + ";";
    return out;
  }
  Table lines{this, "", "MEM:MIRVAL", "LIGNES"};
  int refreshed = 0;
};

TEST_F(CurrencyTest, SwitchConvertsTheDocumentsMemoryOnlyWhenItsCurrencyChanges) {
  const struct {
    const char* cas;
    const char* ident;
    const char* options;
    bool refuse;
    const char* current;
    const char* amounts;
    int refreshed;
  } cases[] = {
      // 50.50 × 1.105 = 55.8025; no decimals in yen: 3126.6 and 7894.665 to the nearest.
      {"dollars", "USD", "QRB", false, "USD", "708500 110.50 22.10;708500 55.80 0.00;", 1},
      {"yens", "JPY", "QRB", false, "JPY", "708500 15633.00 3127.00;708500 7895.00 0.00;", 1},
      {"déjà dans la devise", "USD", "DB", false, "USD", "708500 100.00 20.00;708500 50.50 0.00;", 1},
      {"refusé", "USD", "QRB", true, "EUR", "708500 100.00 20.00;708500 50.50 0.00;", 0},
      {"même devise", "EUR", "QRB", false, "EUR", "708500 100.00 20.00;708500 50.50 0.00;", 1},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.cas);
    euro().definirCourante("EUR", jour("15/03/2024"));
    Document document(c.refuse);
    document.ligne("|000001", "100", "20");
    document.ligne("|000002", "50.5", "0");
    Chaine ident(c.ident), options(c.options);
    Date date(jour("15/03/2024"));
    Double rate(0);
    EvtParamRef bascule(4, &ident, &date, &rate, &options);
    document.ctrl_basculer(&bascule);
    EXPECT_EQ(document.erreurMethode(), c.refuse ? 1 : 0);
    EXPECT_EQ(euro().courante(), c.current);
    EXPECT_EQ(document.montants(), c.amounts);
    EXPECT_EQ(document.refreshed, c.refreshed);
  }
}

}  // namespace
