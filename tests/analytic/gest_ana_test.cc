// The analytic breakdown of one line, opened as an entry screen opens it, on the
// demo dossier's posts, keys and sections (operation dated 15/03/2024).
#include <gtest/gtest.h>

#include <functional>
#include <string>
#include <vector>

#include "model/mains.h"
#include "tests/services/appelant.h"

namespace {

using namespace host;
using model::saisir;
using testing_support::ServicesTest;

// What the caller passes; amounts as typed, "" for zero.
struct Appel {
  std::string debit{}, credit{};
  std::string key{};
  std::string section{};
  int sign = 1;
  std::string mandatory = "N";
  std::string mode = "VMm";
};

class GestAnaTest : public ServicesTest {
 protected:
  void SetUp() override {
    ServicesTest::SetUp();
    sql("INSERT INTO MIRVAL_M01 (IDENT) VALUES ('L1')");
  }

  // Opens the screen for line L1, plays `steps` on it, then closes it; false when
  // the call failed. Post and key come back in `post` and `key`.
  bool ouvrir(const Appel& a, const std::function<void(Session&)>& steps = nullptr) {
    Chaine ident("L1"), mode(a.mode), obligatoire(a.mandatory), section(a.section);
    Date date;
    date = "15/03/2024";
    Double cours(1);
    Monnaie debit, credit;
    debit = *Decimal::parse(a.debit.empty() ? "0" : a.debit);
    credit = *Decimal::parse(a.credit.empty() ? "0" : a.credit);
    Entier signe(a.sign);
    post = "";
    key = a.key;
    EvtParamRef evt(11, &ident, &mode, &date, &cours, &post, &key, &section, &debit, &credit, &signe, &obligatoire);
    user_.ajouterPilotage([&](Session& s, Automate&) {
      if (steps) steps(s);
    });
    return lancer("", "MIRVAE", "GEST_ANA", evt);
  }

  // The line's stored rows in NUMERO order: "SECTION debit/credit".
  std::string rows() {
    return sql("SELECT group_concat(CSECT || ' ' || MTADE || '/' || MTACR, ', ') FROM (SELECT * FROM MIRVAANA_M01 "
               "WHERE NUMERO LIKE 'L1|%' ORDER BY NUMERO)");
  }
  std::vector<std::string> messages() { return vus("message"); }

  static bool row(Session& s, const std::string& section, const std::string& amount) {
    return model::nouvelleLigne(s) && saisir(s, "LST_MIRVAANA_M01.CSECT", section) &&
           saisir(s, "LST_V_MTANA", amount) && model::validerLigne(s);
  }

  Chaine post, key;
};

TEST_F(GestAnaTest, AKeySpreadsTheLineAtStartAndTheFirstRowTakesTheRounding) {
  struct Cas {
    const char* cas;
    const char* setup;
    Appel appel;
    const char* rows;
    std::vector<std::string> messages;
  };
  const Cas cases[] = {
      {"parts égales", "", {.debit = "100", .key = "EGAL"}, "ADMIN 33.34/0, ATELIER 33.33/0, CHANTIER 33.33/0", {}},
      {"au crédit", "", {.credit = "250", .key = "ATEL"}, "ATELIER 0/150, CHANTIER 0/100", {}},
      {"parts nulles", "INSERT INTO VENSE VALUES ('ATEL', 'ADMIN', 0); UPDATE VENSE SET MTVEN = 0",
       {.debit = "100", .key = "ATEL"}, "", {}},
      {"sections écartées",
       "INSERT INTO CRITA VALUES ('MIX', 'Mélange'); INSERT INTO VENSE VALUES ('MIX', 'ATELIER', 1), "
       "('MIX', 'SALON19', 1), ('MIX', 'ZZZ', 1), ('MIX', 'ADMIN', 1); UPDATE SECAN SET DTOUV = '2025-01-01' "
       "WHERE CSECT = 'ADMIN'",
       {.debit = "90", .key = "MIX"}, "ATELIER 90/0",
       {"La date d'ouverture de la section ADMIN est postérieure à la date d'opération !",
        "La section SALON19 est clôturée !", "La section ZZZ est inexistante !"}},
      {"section close acceptée par CLOAN",
       "INSERT INTO CRITA VALUES ('SAL', 'Salon'); INSERT INTO VENSE VALUES ('SAL', 'SALON19', 1); "
       "UPDATE SECAN SET CLOAN = 'O'",
       {.debit = "10", .key = "SAL"}, "SALON19 10/0", {}},
      {"section par défaut sans clé", "", {.credit = "12.5", .section = "ADMIN"}, "ADMIN 0/12.5", {}},
  };
  for (const Cas& c : cases) {
    SCOPED_TRACE(c.cas);
    if (&c != cases) {
      TearDown();
      SetUp();
    }
    if (*c.setup) base().exec(c.setup);
    ASSERT_TRUE(ouvrir(c.appel)) << session().transcript().rendu();
    EXPECT_EQ(rows(), c.rows);
    EXPECT_EQ(messages(), c.messages);
    // Each row stands under the line's prefix with a NUMERO of its own.
    EXPECT_EQ(sql("SELECT COUNT(DISTINCT NUMERO) = COUNT(*) FROM MIRVAANA_M01"), "1");
  }
}

}  // namespace
