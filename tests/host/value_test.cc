#include "host/value.h"

#include <gtest/gtest.h>

#include "host/error.h"
#include "host/text.h"

namespace host {
namespace {

TEST(Date, EndOfMonthAndTextForms) {
  Date d("D", "", "", 0, nullptr);
  d = Date::dJour(Date::finMois(Date::jDate("01/02/2024")));
  EXPECT_EQ(d.chaine(), "29/02/2024");
  d = Date::dJour(Date::finMois(Date::jDate("15/02/2023")));
  EXPECT_EQ(d.chaine(), "28/02/2023");
  for (const char* text : {"29/02/2024", "2024-02-29", "29022024", "29/2/2024", "290224"}) {
    d = text;
    EXPECT_EQ(d.chaine(), "29/02/2024") << text;
  }
  for (auto [typed, read] : {std::pair{"311268", "31/12/2068"}, {"010169", "01/01/1969"}}) {
    d = typed;
    EXPECT_EQ(d.chaine(), read) << typed;
  }
  EXPECT_EQ(Date::eDate("2024-03-01", "/"), "01/03/2024");
  EXPECT_EQ(Date::eDate("2024-03-01", "."), "01.03.2024");
  EXPECT_THROW(Date::eDate("2024-02-30", "/"), HostError);
}

TEST(Date, EmptyDateIsEmptyAndComesFirst) {
  Date empty("E", "", "", 0, nullptr), day("J", "", "", 0, nullptr);
  day = "01/01/2024";
  EXPECT_TRUE(empty.estVide());
  EXPECT_FALSE(empty);
  EXPECT_EQ(empty.chaine(), "");
  EXPECT_TRUE(empty < day);
  EXPECT_THROW(empty.eDate(), HostError);
}

TEST(Date, RefusesWhatIsNotADate) {
  Date d("DTOPE", "", "", 0, nullptr);
  for (const char* bad : {"31/02/2024", "2024/02/01", "demain", "12/13/2024", "1/1/24", "290223", "2902024"}) {
    try {
      d = bad;
      ADD_FAILURE() << bad;
    } catch (const HostError& e) {
      EXPECT_NE(std::string(e.what()).find("DTOPE"), std::string::npos) << e.what();
    }
  }
}

TEST(Chaine, PositionsCountCharactersNotBytes) {
  Chaine c("C", "", "", 0, nullptr);
  c = "Facture client n° [PIECE]";
  EXPECT_EQ(c.longueur(), 25u);
  EXPECT_EQ(c.position("[PIECE]"), 19u);
  EXPECT_EQ(c(17, 17), "°");
  EXPECT_EQ(c.droite(7), "[PIECE]");
  EXPECT_EQ(c(1, 7), "Facture");
  c = "202403";
  EXPECT_EQ(c(5, 6) + "/" + c(1, 4), "03/2024");
}

TEST(Chaine, ATextForTheBooksIsCleanUtf8) {
  const std::pair<const char*, const char*> cases[] = {
      {"Brasserie Lissandre, café 🍺 ; n° 12", nullptr},
      {"Ligne\r\nsuivante", "caractère de contrôle U+000D en position 6"},
      {"a\tb", "caractère de contrôle U+0009 en position 2"},
      {"a\x7F", "caractère de contrôle U+007F en position 2"},
      {"é\xC2\x85", "caractère de contrôle U+0085 en position 2"},          // C1 control
      {"caf\xC3", "octet 0xC3 hors UTF-8 en position 4"},                     // cut short
      {"caf\xE9", "octet 0xE9 hors UTF-8 en position 4"},                     // Latin-1
      {"\xC3\xA9\xA9", "octet 0xA9 hors UTF-8 en position 2"},              // stray continuation
      {"\xC0\xAF", "octet 0xC0 hors UTF-8 en position 1"},                   // overlong
      {"\xE0\x80\xAF", "octet 0xE0 hors UTF-8 en position 1"},              // overlong
      {"\xED\xA0\x80", "octet 0xED hors UTF-8 en position 1"},              // surrogate
      {"\xF4\x90\x80\x80", "octet 0xF4 hors UTF-8 en position 1"},         // beyond U+10FFFF
  };
  for (const auto& [text, why] : cases) {
    auto found = text::flaw(text);
    EXPECT_EQ(found.value_or(""), why ? why : "") << text;
  }
  EXPECT_EQ(text::flaw(std::string("a\0b", 3)).value_or(""), "caractère de contrôle U+0000 en position 2");
}

TEST(Monnaie, ExactArithmeticThroughValues) {
  Monnaie a("A", "", "", 0, nullptr), b("B", "", "", 0, nullptr);
  a = "0.1";
  b = "0.2";
  a = a.decimal() + b.decimal();
  EXPECT_TRUE(a == Monnaie(*Decimal::parse("0.3")));
  EXPECT_EQ(a.chaine(), "0.30");
  Simple rate("T", "", "", 0, nullptr);
  rate = "19.6";
  EXPECT_EQ(rate.chaine(), "19.6");
  // A rate becomes a double through its decimal text, not through a float's binary value.
  Double copy("TXTVA", "", "", 0, nullptr);
  copy = rate;
  EXPECT_EQ(copy.reel(), 19.6);
  Decimal vat = Monnaie::valeurArrondie(Decimal(100) * rate.decimal() / Decimal(100), 2, "=");
  EXPECT_EQ(vat.toString(), "19.60");
  EXPECT_EQ(Monnaie::valeurArrondie(*Decimal::parse("-0.125"), 2, "=").toString(), "-0.13");
  EXPECT_THROW(Monnaie::valeurArrondie(Decimal(1), 2, "?"), HostError);
}

TEST(Donnee, WritingConvertsToTheKindOrRefuses) {
  Entier n("N", "", "", 0, nullptr);
  Monnaie m("M", "", "", 0, nullptr);
  n = "42";
  EXPECT_TRUE(n == 42);
  EXPECT_THROW(n = "4.5", HostError);
  EXPECT_THROW(m = "12,3,4", HostError);
  m = "12,5";
  EXPECT_EQ(m.chaine(), "12.50");
  EXPECT_TRUE(m < 13);
  // A number its kind cannot hold is refused as it is written, never kept to fail later.
  Double d("D", "", "", 0, nullptr);
  Simple f("F", "", "", 0, nullptr);
  EXPECT_THROW(n = "9223372036854775808", HostError);
  EXPECT_THROW(d = "1" + std::string(309, '0'), HostError);
  EXPECT_THROW(f = "1" + std::string(39, '0'), HostError);
  // Far below one, a double still shows itself.
  d = "0." + std::string(320, '0') + "5";
  EXPECT_GT(d.reel(), 0);
  EXPECT_EQ(d.chaine().substr(0, 12), "0.0000000000");
}

TEST(Donnee, BoundVariableReadsAndWritesItsTarget) {
  Chaine caller("CALLER", "", "", 0, nullptr), callee("CALLEE", "", "", 0, nullptr);
  caller = "avant";
  callee.lier(caller);
  EXPECT_EQ(callee, "avant");
  callee = "après";
  EXPECT_EQ(caller, "après");
  EXPECT_THROW(caller.lier(callee), HostError);  // a cycle would never end
}

}  // namespace
}  // namespace host
