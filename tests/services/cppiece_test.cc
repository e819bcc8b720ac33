#include "services/cppiece.h"

#include <gtest/gtest.h>
#include <sqlite3.h>

#include "model/traitmnt.h"
#include "tests/posting/posting_fixture.h"

namespace {

using namespace host;
using Strings = std::vector<std::string>;

// Talks to the import component the way a posting process does, row by row.
struct Pilote : model::Traitmnt {
  explicit Pilote(Evt* e) : Traitmnt(e) {}
};

class CppieceTest : public testing_support::PostingTest {
 protected:
  void SetUp() override {
    PostingTest::SetUp();
    pilote_ = std::make_unique<Pilote>(nullptr);
  }
  void TearDown() override {
    pilote_.reset();
    PostingTest::TearDown();
  }

  int appeler(const char* procedure, Evt& evt) {
    pilote_->appelerProcedure("*", "CPPIECE", "INTERFACE", procedure, &evt, -1);
    return pilote_->erreurMethode();
  }
  int appeler(const char* procedure) {
    EvtParamVal vide(new InfoCode(0, 0, 0, 0, 0, 0));
    return appeler(procedure, vide);
  }
  int appeler(const char* procedure, Donnee& parametre) {
    EvtParamRef evt(1, &parametre);
    return appeler(procedure, evt);
  }
  void ligne(const char* table, const std::string& columns, const Strings& values) {
    std::string marks = "?";
    for (std::size_t i = 0; i < values.size(); ++i) marks += ", ?";
    Statement& s = base().prepare(std::string("INSERT INTO ") + table + " (NINST, " + columns + ") VALUES (" + marks + ")");
    s.bind(1, ninst_.chaine());
    for (std::size_t i = 0; i < values.size(); ++i) s.bind(static_cast<int>(i) + 2, values[i]);
    s.step();
    s.reset();
  }
  void entete() {
    ligne("PIECE_IMM", "NUMJL, DTOPE, NPIEC, INPIE, MONNAIE_IDENT, COURS, CORIG",
          {"VT", "2024-03-15", "VT0042", "Facture", "EUR", "1", "*COMPTA*"});
  }
  void mouvement(const std::string& numcp, const std::string& debit, const std::string& credit) {
    ligne("MOUVE_IMM", "NUMCP, LIBEC, MTDEB, MTCRE", {numcp, "Facture", debit, credit});
  }
  // Sends one movement whole.
  void envoyer(const std::string& numcp, const std::string& debit, const std::string& credit) {
    mouvement(numcp, debit, credit);
    EXPECT_EQ(appeler("DEBUT_LIGNE"), 0);
    EXPECT_EQ(appeler("FIN_LIGNE"), 0);
  }
  int finPiece(const char* flag = "O") {
    Chaine valider(flag);
    return appeler("FIN_PIECE", valider);
  }
  // The error texts of code `code`, as "ERREUR_SUIVANTE" hands them out.
  Strings textes(int code) {
    EXPECT_EQ(appeler("POSDEBUT_ERREUR", ninst_), 0);
    Strings out;
    Entier erreur(code);
    Chaine texte("*");
    while (!texte.estVide()) {
      EvtParamRef evt(3, &erreur, &texte, &ninst_);
      EXPECT_EQ(appeler("ERREUR_SUIVANTE", evt), 0);
      if (!texte.estVide()) out.push_back(texte.chaine());
    }
    return out;
  }

  std::unique_ptr<Pilote> pilote_;
  Chaine ninst_;
  Chaine npies_;
};

TEST_F(CppieceTest, RefusedPieceLeavesNothingAndHandsOutItsTextsOneByOne) {
  session().action([&] {
    ASSERT_EQ(appeler("DEBUT_IMPORT", ninst_), 0);
    entete();
    ASSERT_EQ(appeler("DEBUT_PIECE", npies_), 0);
    envoyer("706000", "0", "100.10");
    envoyer("709999", "0", "20");
    envoyer("411001", "120", "0");
    EXPECT_EQ(finPiece(), services::kPieceRefused);
    EXPECT_EQ(textes(services::kPieceRefused),
              (Strings{"Mouvement 2 : le compte « 709999 » n'existe pas.",
                       "La pièce n'est pas équilibrée : débit 120.00, crédit 120.10."}));
    EXPECT_EQ(textes(services::kPieceRefused).size(), 2u) << "POSDEBUT_ERREUR starts again from the first";
    EXPECT_TRUE(textes(services::kPieceState).empty());
    EXPECT_EQ(appeler("FIN_IMPORT"), 0);
  });
  EXPECT_EQ(compte("SELECT count(*) FROM PIECE") + compte("SELECT count(*) FROM MOUVE"), 0);
  EXPECT_EQ(sql("SELECT ETAT FROM IMPORT_INSTANCE WHERE NINST = '" + ninst_.chaine() + "'"), "F");
  EXPECT_EQ(compte("SELECT count(*) FROM MOUVE_IMM"), 0);
}

TEST_F(CppieceTest, LabelsThatAreNotCleanUtf8AreRefused) {
  session().action([&] {
    ASSERT_EQ(appeler("DEBUT_IMPORT", ninst_), 0);
    ligne("PIECE_IMM", "NUMJL, DTOPE, INPIE, MONNAIE_IDENT", {"VT", "2024-03-15", "Facture\r\nX", "EUR"});
    ASSERT_EQ(appeler("DEBUT_PIECE", npies_), 0);
    ligne("MOUVE_IMM", "NUMCP, LIBEC, MTDEB, MTCRE", {"706000", "Caf\xE9", "0", "100"});
    EXPECT_EQ(appeler("DEBUT_LIGNE"), 0);
    EXPECT_EQ(appeler("FIN_LIGNE"), 0);
    envoyer("411001", "100", "0");
    EXPECT_EQ(finPiece(), services::kPieceRefused);
    EXPECT_EQ(textes(services::kPieceRefused),
              (Strings{"Le libellé de la pièce est refusé : caractère de contrôle U+000D en position 8.",
                       "Mouvement 1 : le libellé est refusé : octet 0xE9 hors UTF-8 en position 4."}));
    EXPECT_EQ(appeler("FIN_IMPORT"), 0);
  });
  EXPECT_EQ(compte("SELECT count(*) FROM PIECE") + compte("SELECT count(*) FROM MOUVE"), 0);
}

TEST_F(CppieceTest, PieceNotClosedWholeLeavesNothing) {
  session().action([&] {
    ASSERT_EQ(appeler("DEBUT_IMPORT", ninst_), 0);
    entete();
    ASSERT_EQ(appeler("DEBUT_PIECE", npies_), 0);
    envoyer("706000", "0", "100");
    mouvement("411001", "100", "0");
    EXPECT_EQ(appeler("DEBUT_LIGNE"), 0);
    EXPECT_EQ(finPiece(), services::kMovementState) << "its last movement is still open";

    entete();
    ASSERT_EQ(appeler("DEBUT_PIECE", npies_), 0);
    envoyer("706000", "0", "100");
    envoyer("411001", "100", "0");
    EXPECT_EQ(appeler("FIN_IMPORT"), services::kPieceState) << "closed before its FIN_PIECE";
  });
  EXPECT_EQ(compte("SELECT count(*) FROM PIECE") + compte("SELECT count(*) FROM MOUVE"), 0);
}

TEST_F(CppieceTest, ProceduresCalledOutOfTurnAreRefusedWithTheirCode) {
  session().action([&] {
    EXPECT_EQ(appeler("DEBUT_PIECE", npies_), services::kNoInstance);
    ASSERT_EQ(appeler("DEBUT_IMPORT", ninst_), 0);
    EXPECT_EQ(appeler("DEBUT_PIECE", npies_), services::kMissingRow) << "no header written";
    EXPECT_EQ(appeler("DEBUT_LIGNE"), services::kPieceState);
    entete();
    ASSERT_EQ(appeler("DEBUT_PIECE", npies_), 0);
    EXPECT_EQ(appeler("ANALYTIQUE"), services::kMovementState);
    envoyer("706000", "0", "100");
    EXPECT_EQ(appeler("DEBUT_LIGNE"), services::kMissingRow) << "the same row is never read twice";
    EXPECT_EQ(finPiece("X"), services::kBadParameter);
    EXPECT_EQ(finPiece("N"), 0);
    Chaine inconnue("99999999");
    EXPECT_EQ(appeler("POSDEBUT_ERREUR", inconnue), services::kUnknownInstance);
    EXPECT_EQ(appeler("FIN_IMPORT"), 0);
  });
  EXPECT_EQ(compte("SELECT count(*) FROM PIECE"), 0);
}

TEST_F(CppieceTest, LedgerRefusesWhatItCannotAccept) {
  const std::string entete = "Erreur lors validation de la pièce :@";
  struct Case {
    const char* name;
    const char* setup;  // SQL run on the dossier first
    testing_support::OperationEssai operation;
    const char* text;
  } cases[] = {
      {"unknown journal", "", {.lignes = {{"706000", "100"}}, .numjl = "ZZ"}, "Le journal « ZZ » n'existe pas."},
      {"no date", "", {.lignes = {{"706000", "100"}}, .dtope = ""}, "La date de la pièce est absente."},
      {"before the exercise", "", {.lignes = {{"706000", "100"}}, .dtope = "2023-12-31"},
       "La date du 31/12/2023 précède le début de l'exercice (01/01/2024)."},
      {"after the closing date", "UPDATE PARAM SET PDTCL = '2024-06-30'", {.lignes = {{"706000", "100"}}, .dtope = "2024-07-01"},
       "La date du 01/07/2024 dépasse la date de clôture de la saisie (30/06/2024)."},
      {"month closed by the journal", "UPDATE JONAL SET CLOAM = '202403' WHERE NUMJL = 'VT'",
       {.lignes = {{"706000", "100"}}}, "La période 03/2024 est clôturée pour le journal « VT »."},
      {"unknown account", "", {.lignes = {{"709999", "100"}}}, "Mouvement 1 : le compte « 709999 » n'existe pas."},
      {"currency unknown to the dossier", "", {.lignes = {{"706000", "100"}}, .monnaie = "XXX"},
       "La pièce en XXX ne peut être valorisée en EUR : "},
      {"unbalanced", "", {.lignes = {{"706000", "100"}}, .ttc = "100.01"},
       "La pièce n'est pas équilibrée : débit 100.01, crédit 100.00."},
      {"analytic rows short of their movement", "",
       {.lignes = {{.numcp = "706000", .ht = "100", .ventilation = {{"ATELIER", "0", "60"}, {"CHANTIER", "0", "39.99"}}}}},
       "Mouvement 1 : la ventilation analytique (débit 0.00, crédit 99.99) ne totalise pas le mouvement (débit 0.00, "
       "crédit 100.00)."},
  };
  int n = 0;
  for (const Case& c : cases) {
    SCOPED_TRACE(c.name);
    if (*c.setup) base().exec(c.setup);
    session().transcript().vider();
    testing_support::OperationEssai op = c.operation;
    op.ident = "OP00000" + std::to_string(++n);
    ecrire(op);
    poster(op.ident);
    ASSERT_EQ(messages().size(), 1u);
    EXPECT_EQ(messages()[0].substr(0, entete.size() + std::string(c.text).size()), entete + c.text);
    EXPECT_EQ(compte("SELECT count(*) FROM PIECE") + compte("SELECT count(*) FROM MOUVE"), 0);
    base().exec("UPDATE PARAM SET PDTCL = '2024-12-31'; UPDATE JONAL SET CLOAM = ''");
  }
}

TEST_F(CppieceTest, ForeignPieceIsValuedAtItsRateAndBalancesInBothCurrencies) {
  ecrire({.lignes = {{"706000", "1"}, {"706100", "1"}, {"706300", "1"}}, .monnaie = "USD", .cours = "3"});
  poster();
  std::string piece = npies();
  // A third of a dollar each is 0.33 EUR; the cent the rounding lost goes to the
  // first of the largest credits.
  EXPECT_EQ(mouvements(piece), (Strings{"706000 C 0.34", "706100 C 0.33", "706300 C 0.33", "411001 D 1.00"}));
  EXPECT_EQ(sql("SELECT group_concat(MTCRES, ' ') FROM MOUVE WHERE NPIES = '" + piece + "' AND NUMCP LIKE '7%'"),
            "1 1 1");
  EXPECT_EQ(sql("SELECT MTECH || ' ' || MTECHS FROM ECHEA WHERE NPIES = '" + piece + "'"), "1 3");
  EXPECT_TRUE(messages().empty());
}

TEST_F(CppieceTest, NumbersAreNeverHandedOutTwice) {
  ecrire({.lignes = {{"706000", "100"}}, .ttc = "1"});
  poster();  // refused: its numbers are spent all the same
  std::string refused = npies();
  ecrire({.ident = "OP000002", .lignes = {{"706000", "100"}}});
  poster("OP000002");
  std::string first = npies("OP000002");
  EXPECT_GT(first, refused);
  // A counter set back never goes below what the ledger already holds.
  base().exec("UPDATE NDOC SET DERNIER = 0");
  ecrire({.ident = "OP000003", .lignes = {{"706000", "100"}}});
  poster("OP000003");
  EXPECT_GT(npies("OP000003"), first);
  EXPECT_EQ(compte("SELECT count(DISTINCT UNIQ) FROM MOUVE"), 4);
  EXPECT_EQ(compte("SELECT count(DISTINCT NUSYS) FROM ECHEA"), 2);
}

// Numbering a piece finds the largest number already in the ledger through the keys,
// not by reading every piece and instance: posting stays as fast in a dossier of
// years as in a new one. Numbers of another shape are no obstacle.
TEST_F(CppieceTest, NumberingFindsTheLargestNumberThroughTheKeys) {
  base().exec(R"(
    WITH RECURSIVE n(i) AS (SELECT 1 UNION ALL SELECT i + 1 FROM n WHERE i < 2000)
    INSERT INTO PIECE (NPIES) SELECT printf('%011d', i) FROM n;
    WITH RECURSIVE n(i) AS (SELECT 1 UNION ALL SELECT i + 1 FROM n WHERE i < 2000)
    INSERT INTO IMPORT_INSTANCE (NINST, ETAT) SELECT printf('%08d', i), 'F' FROM n;
    INSERT INTO PIECE (NPIES) VALUES ('P99'), ('9'), ('0000000300x');)");
  // Work of the numbering statements, in virtual machine steps.
  long long steps = 0;
  sqlite3_trace_v2(
      base().brut(), SQLITE_TRACE_PROFILE,
      [](unsigned, void* out, void* statement, void*) {
        auto* stmt = static_cast<sqlite3_stmt*>(statement);
        if (std::string(sqlite3_sql(stmt)).find("NDOC") != std::string::npos)
          *static_cast<long long*>(out) += sqlite3_stmt_status(stmt, SQLITE_STMTSTATUS_VM_STEP, 1);
        return 0;
      },
      &steps);
  ecrire({.lignes = {{"706000", "100"}}});
  poster();
  sqlite3_trace_v2(base().brut(), 0, nullptr, nullptr);
  EXPECT_EQ(npies(), "00000002001");
  EXPECT_EQ(sql("SELECT NINST FROM PIECE WHERE NPIES = '00000002001'"), "00002001");
  EXPECT_LT(steps, 1000);
}

}  // namespace
