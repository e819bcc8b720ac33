#include "access/acces.h"

#include <gtest/gtest.h>

#include "host/registry.h"
#include "model/mains.h"
#include "model/traitmnt.h"
#include "tests/support/fixture.h"

namespace {

using namespace host;
namespace mains = model;

// What the access screen handed to the module it opened.
struct Lancement {
  std::string module, ident, mode;
};
std::vector<Lancement> lancements;

// Stands in for the entry screen and the piece view: records its parameters, ends.
template <int N>
struct Doublure : model::Traitmnt {
  explicit Doublure(Evt* e) : Traitmnt(e) {
    Lancement l{N == 0 ? "GESTION1" : "VISUECRI", "", ""};
    if (e->nbParams() > 0) l.ident = e->parametre(0).chaine();
    if (e->nbParams() > 1) l.mode = e->parametre(1).chaine();
    lancements.push_back(l);
  }
};

class Acces1Test : public testing_support::DossierTest {
 protected:
  void SetUp() override {
    DossierTest::SetUp();
    lancements.clear();
    gestion_ = Registre::instance().substituer("MIRVAE-GESTION1", &fabriquer<Doublure<0>>);
    visu_ = Registre::instance().substituer("COMPTA-VISUECRI", &fabriquer<Doublure<1>>);
    // Three client invoices of February and March, one supplier invoice, one of the
    // previous exercise whose piece is gone, one of a client that no longer exists.
    base().exec(R"(
      INSERT INTO MIRVAE (IDENT, TYPE, DTOPE, NUMCP, NPIEC, NPIES) VALUES
        ('00000001', 'FC', '2024-02-05', '411001', 'VT0001', 'P1'),
        ('00000002', 'FC', '2024-02-20', '411002', 'VT0002', ''),
        ('00000003', 'FC', '2024-03-02', '411001', 'VT0003', 'P3'),
        ('00000004', 'FF', '2024-02-10', '401001', 'AC0001', ''),
        ('00000005', 'FC', '2023-12-28', '411001', 'VT0099', 'P0'),
        ('00000006', 'FC', '2024-02-25', '411999', 'VT0004', '');
      INSERT INTO PIECE (NPIES, IMPUT) VALUES ('P1', 'O'), ('P3', '');
    )");
  }
  void TearDown() override {
    Registre::instance().substituer("MIRVAE-GESTION1", gestion_);
    Registre::instance().substituer("COMPTA-VISUECRI", visu_);
    DossierTest::TearDown();
  }

  void ouvrirEcran() { ASSERT_TRUE(mains::ouvrir(session(), "MIRVAE-ACCES1")); }
  std::vector<std::string> idents() {
    std::vector<std::string> out;
    for (const auto& row : mains::lignes(session())) out.push_back(row.at("IDENT"));
    return out;
  }
  std::string v(const char* object) { return mains::valeur(session(), object); }
  std::string libelleClient(const char* numcp) { return sql(std::string("SELECT LIBCP FROM COMPT WHERE NUMCP = '") + numcp + "'"); }

  Fabrique gestion_ = nullptr, visu_ = nullptr;
};

TEST_F(Acces1Test, PeriodComboHasTheMonthsThenNoPeriodAndTheTwoExercises) {
  base().exec("UPDATE PARAM SET PDTCL = '2025-02-28'");
  ouvrirEcran();
  auto& screen = static_cast<browser::MIRVAEAcces&>(mains::ecranDevant(session()));
  std::vector<std::string> rows;
  Table& mem04 = *screen.tableNommee("MEM04");
  Champ anmoi("ANMOI", &mem04), exercice("EXERCICE", &mem04), moian("MOIAN", &mem04);
  for (int rc = mem04.suivant(3); rc == 0; rc = mem04.suivant(1)) {
    screen.executer("VMOIAN_SELECTION", nullptr);
    rows.push_back(anmoi.chaine() + "|" + exercice.chaine() + "|" + moian.chaine() + "|" +
                   screen.variable("MOANO_CHEV")->chaine());
  }
  ASSERT_EQ(rows.size(), 14u + 3u);
  EXPECT_EQ(rows.front(), "202401|N|01/2024|N");
  EXPECT_EQ(rows[11], "202412|N|12/2024|N");
  EXPECT_EQ(rows[13], "202502|N+1|02/2025|O");
  EXPECT_EQ(rows[14], "|||N");
  EXPECT_EQ(rows[15], " Exercice N|N| Exercice N|N");
  EXPECT_EQ(rows[16], " Exercice N+1|N+1| Exercice N+1|N");
}

TEST_F(Acces1Test, PeriodsGiveTheirDateRanges) {
  ouvrirEcran();
  struct Case {
    const char* period;
    const char* from;
    const char* to;
  } cases[] = {
      {"02/2024", "01/02/2024", "29/02/2024"},
      {" Exercice N", "01/01/2024", "31/12/2024"},
      {" Exercice N+1", "01/01/2025", "31/12/2024"},
      {"", "", "31/12/2024"},  // no lower bound, the closing date above
  };
  for (const auto& c : cases) {
    ASSERT_TRUE(mains::saisir(session(), "VMOIAN", c.period)) << c.period;
    EXPECT_EQ(v("VDATE_DEBUT"), c.from) << c.period;
    EXPECT_EQ(v("VDATE_FIN"), c.to) << c.period;
  }
  mains::saisir(session(), "VMOIAN", "");
  EXPECT_EQ(idents(), (std::vector<std::string>{"00000005", "00000001", "00000002", "00000006", "00000003"}));
}

TEST_F(Acces1Test, DatesOutsideThePeriodAreRefused) {
  ouvrirEcran();
  mains::saisir(session(), "VMOIAN", "02/2024");
  EXPECT_FALSE(mains::saisir(session(), "VDATE_DEBUT", "31/01/2024"));
  EXPECT_EQ(session().transcript().textes("message").back(),
            "La date début doit être comprise entre le 01/02/2024 et le 29/02/2024 !");
  EXPECT_EQ(v("VDATE_DEBUT"), "01/02/2024");
  EXPECT_FALSE(mains::saisir(session(), "VDATE_FIN", "01/03/2024"));
  EXPECT_EQ(session().transcript().textes("message").back(),
            "La date fin doit être comprise entre le 01/02/2024 et le 29/02/2024 !");
  EXPECT_TRUE(mains::saisir(session(), "VDATE_DEBUT", "10/02/2024"));
  EXPECT_EQ(idents(), (std::vector<std::string>{"00000002", "00000006"}));
}

TEST_F(Acces1Test, FiltersByClientAndPieceNumber) {
  ouvrirEcran();
  mains::saisir(session(), "VMOIAN", "");
  ASSERT_TRUE(mains::saisir(session(), "VLIBCP1", libelleClient("411001")));
  EXPECT_EQ(v("VNUMCP1"), "411001");
  EXPECT_EQ(v("VNUMCP_TOUS"), "");
  EXPECT_EQ(idents(), (std::vector<std::string>{"00000005", "00000001", "00000003"}));
  ASSERT_TRUE(mains::saisir(session(), "VNPIEC", "VT0003"));
  EXPECT_EQ(idents(), std::vector<std::string>{"00000003"});
  ASSERT_TRUE(mains::saisir(session(), "VNUMCP_TOUS", "O"));
  ASSERT_TRUE(mains::saisir(session(), "VNPIEC_TOUS", "O"));
  EXPECT_EQ(idents().size(), 5u);
  EXPECT_FALSE(mains::saisir(session(), "VLIBCP1", "Personne de ce nom"));
  EXPECT_EQ(session().transcript().textes("message").back(), "Le compte Client est inexistant !");
}

TEST_F(Acces1Test, PostingStateFilterCountsAGonePieceOfAPastExerciseAsPosted) {
  ouvrirEcran();
  mains::saisir(session(), "VMOIAN", "");
  mains::saisir(session(), "VIMPUT", "O");
  EXPECT_EQ(idents(), (std::vector<std::string>{"00000005", "00000001"}));
  mains::saisir(session(), "VIMPUT", "N");
  EXPECT_EQ(idents(), (std::vector<std::string>{"00000002", "00000006", "00000003"}));
}

TEST_F(Acces1Test, RowOfAGoneAccountIsTitledSo) {
  ouvrirEcran();
  mains::saisir(session(), "VMOIAN", "");
  auto rows = mains::lignes(session());
  ASSERT_EQ(rows.size(), 5u);
  EXPECT_EQ(rows[3].at("VLIBCP2"), "Client <411999> inexistant !");
  EXPECT_EQ(rows[1].at("VLIBCP2"), libelleClient("411001"));
}

TEST_F(Acces1Test, ActionsOpenTheEntryScreenWithIdentAndMode) {
  ouvrirEcran();
  mains::saisir(session(), "VMOIAN", "");
  mains::choisirLigne(session(), 2);
  ASSERT_TRUE(mains::appuyer(session(), "GERER"));
  ASSERT_TRUE(mains::appuyer(session(), "MODIFIER"));
  ASSERT_TRUE(mains::appuyer(session(), "CREER"));
  ASSERT_EQ(lancements.size(), 3u);
  EXPECT_EQ(lancements[0].ident, "00000001");
  EXPECT_EQ(lancements[0].mode, "VMCAv");
  EXPECT_EQ(lancements[1].mode, "VMCAm");
  EXPECT_EQ(lancements[2].mode, "VMCAc");
  EXPECT_EQ(v("VIDENT"), "");
}

TEST_F(Acces1Test, ClosedYearNotReopenedOnlyAllowsConsultation) {
  base().exec("UPDATE PARAM SET PXCLO = 'C'");
  ouvrirEcran();
  mains::saisir(session(), "VMOIAN", "");
  // Declined at the screen's question, or at the reopening's own confirmation.
  for (const std::vector<bool>& answers : {std::vector<bool>{false}, std::vector<bool>{true, false}})
    for (const char* action : {"MODIFIER", "CREER"}) {
      for (bool answer : answers) user_.ajouterOui(answer);
      mains::appuyer(session(), action);
    }
  EXPECT_TRUE(lancements.empty());
  EXPECT_EQ(sql("SELECT PXCLO FROM PARAM"), "C");
  EXPECT_EQ(session().transcript().textes("question").size(), 6u);
  mains::appuyer(session(), "GERER");
  ASSERT_EQ(lancements.size(), 1u);
  EXPECT_EQ(lancements[0].mode, "Vv");
}

TEST_F(Acces1Test, ClosedYearWithoutReopeningRefusesWithItsLabel) {
  base().exec("UPDATE PARAM SET PXCLO = 'O'");
  ouvrirEcran();
  mains::appuyer(session(), "CREER");
  EXPECT_TRUE(lancements.empty());
  EXPECT_EQ(session().transcript().textes("message").back(), sql("SELECT TEXTE FROM LIBEL WHERE CODE = '0240'"));
}

TEST_F(Acces1Test, AcceptedReopeningLetsTheCreationGoOn) {
  base().exec("UPDATE PARAM SET PXCLO = 'C'");
  ouvrirEcran();
  user_.ajouterOui(true);  // reopen?
  user_.ajouterOui(true);  // the reopening's own confirmation
  mains::appuyer(session(), "CREER");
  EXPECT_EQ(sql("SELECT PXCLO FROM PARAM"), "N");
  ASSERT_EQ(lancements.size(), 1u);
  EXPECT_EQ(lancements[0].mode, "VMCAc");
}

TEST_F(Acces1Test, PieceViewNeedsAnExistingPostedPiece) {
  ouvrirEcran();
  mains::saisir(session(), "VMOIAN", "");
  struct Case {
    int row;
    const char* message;
  } cases[] = {
      {3, "Opération refusée car la pièce n'a pas été comptabilisée."},
      {1, "Opération impossible car la pièce <P0> est inexistante !"},
  };
  for (const auto& c : cases) {
    mains::choisirLigne(session(), c.row);
    mains::appuyer(session(), "VISU_PIECE");
    EXPECT_EQ(session().transcript().textes("message").back(), c.message);
  }
  EXPECT_TRUE(lancements.empty());
  mains::choisirLigne(session(), 2);
  mains::appuyer(session(), "VISU_PIECE");
  ASSERT_EQ(lancements.size(), 1u);
  EXPECT_EQ(lancements[0].module, "VISUECRI");
  EXPECT_EQ(lancements[0].ident, "P1");
}

TEST_F(Acces1Test, PrintsHandTheirRequest) {
  ouvrirEcran();
  mains::saisir(session(), "VMOIAN", "02/2024");
  auto& screen = mains::ecranDevant(session());
  std::string request = screen.table(false)->requete();
  EXPECT_NE(request.find("TYPE = 'FC'"), std::string::npos) << request;
  EXPECT_NE(request.find("DTOPE >= '2024-02-01'"), std::string::npos) << request;
  EXPECT_NE(request.find("DTOPE <= '2024-02-29'"), std::string::npos) << request;
}

struct Depart {
  const char* sql;
  const char* message;  // "" when the screen leaves without its own message
};

class Acces1DepartTest : public Acces1Test, public ::testing::WithParamInterface<Depart> {};

TEST_P(Acces1DepartTest, ScreenLeavesAtOnce) {
  base().exec(GetParam().sql);
  EXPECT_FALSE(mains::ouvrir(session(), "MIRVAE-ACCES1"));
  EXPECT_EQ(session().ecran("MIRVAE-ACCES1"), nullptr);
  if (*GetParam().message) {
    EXPECT_EQ(session().transcript().textes("message").back(), GetParam().message);
  }
}

INSTANTIATE_TEST_SUITE_P(
    Departs, Acces1DepartTest,
    ::testing::Values(Depart{"UPDATE PARAM SET PRE18 = 'N'",
                             "L'option < Gestion simplifiée des opérations > n'est pas active !"},
                      Depart{"DELETE FROM PARAM", ""}));

}  // namespace

namespace {

class RegistreTest : public testing_support::DossierTest {};

TEST_F(RegistreTest, UnitsDeclareInLoadOrder) {
  std::vector<std::string> library;
  for (const auto& d : host::Registre::instance().declarations())
    if (d.name.rfind("MIRVAE", 0) == 0 || d.sorte != host::Declaration::kModule) {
      const char* kind[] = {"Global", "Module", "Source", "Variable"};
      library.push_back(std::string(kind[d.sorte]) + " " + d.name);
    }
  std::vector<std::string> expected = {
      "Global MIRVAE", "Module MIRVAE-ACCES1", "Source MIRVAE",
      "Global MIRVAE", "Module MIRVAE-CREER_PIECE_FC", "Module MIRVAE-GESTION1", "Module MIRVAE-SUPPRIMER_PIECE",
      "Module MIRVAE-VERIFIER_MODIF_PIECE", "Source MIRVAE",
      "Global MIRVAE", "Module MIRVAE-CREER_PIECE_FF", "Module MIRVAE-GESTION2", "Source MIRVAE",
      "Global MIRVAE", "Module MIRVAE-CREER_PIECE_NDF", "Module MIRVAE-GESTION3", "Source MIRVAE",
      "Global MIRVAE", "Module MIRVAE-CREER_PIECE_BQ", "Source MIRVAE",
      "Global MIRVAE", "Module MIRVAE-CREER_PIECE_CA", "Source MIRVAE",
      "Global MIRVAE", "Module MIRVAE-CREER_PIECE_OD", "Source MIRVAE",
      "Global COMPTA", "Global MIRVAE", "Module MIRVAE-INTERFACE", "Source MIRVAE"};
  EXPECT_EQ(library, expected);
  for (const auto& d : host::Registre::instance().declarations())
    if (d.sorte == host::Declaration::kModule && d.name.rfind("MIRVAE", 0) == 0) {
      EXPECT_EQ(d.label, "") << d.name;
    }
}

}  // namespace
