// The analytic breakdown of one line, opened as an entry screen opens it, on the
// demo dossier's posts, keys and sections (operation dated 15/03/2024).
#include <gtest/gtest.h>

#include <functional>
#include <sstream>
#include <string>
#include <vector>

#include "app/exports.h"
#include "model/mains.h"
#include "tests/entry/gestion1_fixture.h"
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

namespace {

TEST_F(GestAnaTest, ValidationWantsTheRowsToTotalTheMovement) {
  struct Cas {
    const char* cas;
    Appel appel;
    std::vector<std::pair<const char*, const char*>> typed;  // section, amount
    bool saved;
    const char* message;
  };
  const Cas cases[] = {
      {"mouvement nul obligatoire", {.mandatory = "O"}, {}, true, ""},
      {"aucune ligne, facultative", {.debit = "100"}, {}, true, ""},
      {"obligatoire sans poste", {.debit = "100", .mandatory = "O"}, {}, false,
       "La saisie de la ventilation analytique est obligatoire pour ce compte !"},
      {"total exact", {.debit = "100"}, {{"ATELIER", "60"}, {"CHANTIER", "40"}}, true, ""},
      {"un centime de moins", {.debit = "100"}, {{"ATELIER", "60"}, {"CHANTIER", "39.99"}}, false,
       "Le total ventilé est différent du montant du mouvement !"},
  };
  for (const Cas& c : cases) {
    SCOPED_TRACE(c.cas);
    if (&c != cases) {
      TearDown();
      SetUp();
    }
    bool saved = false;
    ASSERT_TRUE(ouvrir(c.appel, [&](Session& s) {
      for (const auto& [section, amount] : c.typed) ASSERT_TRUE(row(s, section, amount));
      saved = model::appuyer(s, "VALID_DOC");
    }));
    EXPECT_EQ(saved, c.saved);
    EXPECT_EQ(messages().empty() ? "" : messages().back(), std::string(c.message));
  }
}

TEST_F(GestAnaTest, ASectionIsTakenOnceAndOnlyWhileOpenAtTheOperationDate) {
  sql("UPDATE SECAN SET DTCLO = '2024-01-31' WHERE CSECT = 'ADMIN'");
  sql("INSERT INTO SECAN VALUES ('FUTUR', 'Futur', 'N', 'N', '2025-01-01', '')");
  sql("INSERT INTO SECAN VALUES ('LIBRE', 'Toujours ouverte', 'O', 'O', '2025-01-01', '2020-01-01')");
  const std::pair<const char*, const char*> cases[] = {
      {"ATELIER", "La section a déjà été saisie !"},
      {"SALON19", "Cette section est clôturée...Saisie impossible !"},
      {"FUTUR", "La date d'ouverture de la section est postérieure à la date d'opération...Saisie impossible !"},
      {"ADMIN", "La date de clôture de la section est antérieure à la date d'opération...Saisie impossible "},
      {"ZZZ", "La section est inexistante !"},
      {"LIBRE", ""},
  };
  ASSERT_TRUE(ouvrir({.debit = "100"}, [&](Session& s) {
    ASSERT_TRUE(row(s, "ATELIER", "60"));
    // The row being changed may keep its own section.
    ASSERT_TRUE(model::allerLigne(s, 1));
    EXPECT_TRUE(saisir(s, "LST_MIRVAANA_M01.CSECT", "ATELIER"));
    ASSERT_TRUE(model::validerLigne(s));
    ASSERT_TRUE(model::nouvelleLigne(s));
    for (const auto& [section, message] : cases) {
      SCOPED_TRACE(section);
      std::size_t seen = messages().size();
      EXPECT_EQ(saisir(s, "LST_MIRVAANA_M01.CSECT", section), *message == '\0');
      EXPECT_EQ(messages().size() == seen ? "" : messages().back(), std::string(message));
    }
  }));
}

// The user opens the section column's choice as any list column's: the sections come.
TEST_F(GestAnaTest, TheSectionColumnOpensTheSectionChooser) {
  user_.ajouterChoix("CHANTIER");
  ASSERT_TRUE(ouvrir({.debit = "100"}, [&](Session& s) {
    ASSERT_TRUE(model::nouvelleLigne(s));
    EXPECT_TRUE(model::ouvrirChoix(s, "LST_MIRVAANA_M01.CSECT")) << s.transcript().rendu();
    EXPECT_EQ(model::valeur(s, "LST_MIRVAANA_M01.CSECT"), "CHANTIER");
  }));
}

TEST_F(GestAnaTest, TheBalanceButtonGivesWhatIsMissingAndNeverLess) {
  ASSERT_TRUE(ouvrir({.credit = "100"}, [&](Session& s) {
    ASSERT_TRUE(row(s, "ATELIER", "60"));
    ASSERT_TRUE(model::nouvelleLigne(s) && saisir(s, "LST_MIRVAANA_M01.CSECT", "CHANTIER"));
    ASSERT_TRUE(model::appuyer(s, "BT_SOLDE"));
    EXPECT_EQ(model::valeur(s, "LST_V_MTANA"), "40.00");
    ASSERT_TRUE(saisir(s, "LST_V_MTANA", "50") && model::validerLigne(s));
    ASSERT_TRUE(model::nouvelleLigne(s) && saisir(s, "LST_MIRVAANA_M01.CSECT", "ADMIN"));
    ASSERT_TRUE(model::appuyer(s, "BT_SOLDE"));
    EXPECT_EQ(model::valeur(s, "LST_V_MTANA"), "0.00");
    EXPECT_EQ(model::valeur(s, "V_RESTE_ANA"), "-10.00");
  }));
}

// A negative line turned to the other side: the user sees and types the line's sign.
TEST_F(GestAnaTest, TheSignShowsTheLineAsTypedAndStoresItOnTheMovementSide) {
  ASSERT_TRUE(ouvrir({.credit = "100", .sign = -1}, [&](Session& s) {
    EXPECT_EQ(model::valeur(s, "V_MTLIG"), "-100.00");
    ASSERT_TRUE(row(s, "ATELIER", "-20"));
    EXPECT_EQ(model::valeur(s, "V_TOT_ANA"), "-20.00");
    ASSERT_TRUE(row(s, "CHANTIER", "-80"));
    EXPECT_TRUE(model::appuyer(s, "VALID_DOC"));
  }));
  EXPECT_EQ(rows(), "ATELIER 0/20, CHANTIER 0/80");
}

TEST_F(GestAnaTest, RowsOfALineThatChangedSideAndAmountFollowIt) {
  sql("INSERT INTO MIRVAANA_M01 VALUES ('A1', 'L1|000001', 'ATELIER', '10', '0'), "
      "('A2', 'L1|000002', 'CHANTIER', '10', '0'), ('A3', 'L1|000003', 'ADMIN', '10', '0')");
  ASSERT_TRUE(ouvrir({.credit = "100"}));
  EXPECT_EQ(rows(), "ATELIER 0/33.34, CHANTIER 0/33.33, ADMIN 0/33.33");
}

TEST_F(GestAnaTest, ChoosingAKeyReplacesTheRowsAndConsultationRefusesEveryChooser) {
  user_.ajouterChoix("EGAL");
  ASSERT_TRUE(ouvrir({.debit = "100", .section = "ATELIER"}, [&](Session& s) {
    EXPECT_TRUE(model::appuyer(s, "CPCRITA_CHOISIR")) << s.transcript().rendu();
    EXPECT_TRUE(model::appuyer(s, "VALID_DOC"));
  }));
  EXPECT_EQ(rows(), "ADMIN 33.34/0, ATELIER 33.33/0, CHANTIER 33.33/0");
  EXPECT_EQ(key, "EGAL");

  for (const char* chooser : {"CPPOANA_CHOISIR", "CPCRITA_CHOISIR", "CPSECAN_CHOISIR"}) {
    SCOPED_TRACE(chooser);
    ASSERT_TRUE(ouvrir({.debit = "100", .mode = "Vv"}, [&](Session& s) { model::appuyer(s, chooser); }));
    EXPECT_EQ(messages().back(), "Opération interdite en mode visualisation !");
  }
  EXPECT_EQ(rows(), "ADMIN 33.34/0, ATELIER 33.33/0, CHANTIER 33.33/0");
}

}  // namespace

namespace {

// A client invoice on a sales account with a key: the spread proposed when the
// analytic screen opens is kept with the operation and reaches the ledger with its
// movement.
class AnalyticRoadTest : public testing_support::Gestion1Test {};

TEST_F(AnalyticRoadTest, TheRowsWrittenAtStartReachTheLedgerWithTheirMovement) {
  user_.ajouterPilotage([](Session& s, Automate&) { model::appuyer(s, "VALID_DOC"); });
  ASSERT_TRUE(creer() && client() && ligne("707000", "100") && model::allerLigne(session(), 1));
  ASSERT_TRUE(appuyer("BT_ANALYTIQUE"));
  ASSERT_TRUE(enregistrer("1")) << session().transcript().rendu();
  EXPECT_EQ(sql("SELECT group_concat(CSECT || ' ' || MTACR, ', ') FROM (SELECT * FROM MIRVAANA ORDER BY NUMERO)"),
            "ATELIER 60, CHANTIER 40") << session().transcript().rendu();
  EXPECT_EQ(sql("SELECT group_concat(V.CSECT || ' ' || V.MTACR || ' ' || M.MTCRE, ', ') FROM VTSEC V "
                "JOIN MOUVE M ON M.UNIQ = V.MOUVE_UNIQ"),
            "ATELIER 60 100, CHANTIER 40 100");
  EXPECT_TRUE(testing_support::incoherences(base()).empty());
  // The printed ledger shows the rows under their movement.
  std::ostringstream ledger;
  app::imprimerGrandLivre(base(), ledger);
  EXPECT_NE(ledger.str().find("section ATELIER"), std::string::npos) << ledger.str();
  EXPECT_NE(ledger.str().find("section CHANTIER"), std::string::npos) << ledger.str();
}

}  // namespace
