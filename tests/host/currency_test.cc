#include "host/currency.h"

#include <gtest/gtest.h>

#include "host/error.h"
#include "tests/support/fixture.h"

namespace {

using namespace host;

Jour jour(const char* text) { return *lireJour(text); }
Decimal dec(const char* text) { return *Decimal::parse(text); }
std::string txt(const Decimal& d) { return d.toString(0); }

using CurrencyTest = testing_support::DossierTest;

TEST_F(CurrencyTest, KnowsEachCurrencyOfTheDossier) {
  struct Case {
    const char* ident;
    int decimals;
    bool zone, reference, fixed;
  };
  for (Case c : {Case{"EUR", 2, true, true, true}, Case{"FRF", 2, true, false, true},
                 Case{"USD", 2, false, false, false}, Case{"JPY", 0, false, false, false},
                 Case{"XPF", 0, false, false, true}}) {
    SCOPED_TRACE(c.ident);
    EXPECT_EQ(euro().decimales(c.ident), c.decimals);
    EXPECT_EQ(euro().estZoneEuro(c.ident), c.zone);
    EXPECT_EQ(euro().estReference(c.ident), c.reference);
    EXPECT_EQ(euro().estCoursFixe(c.ident), c.fixed);
  }
  EXPECT_EQ(euro().tenue(), "EUR");
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

}  // namespace
