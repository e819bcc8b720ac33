#include <algorithm>
#include <map>

#include <gtest/gtest.h>

#include "services/cppiece.h"
#include "tests/posting/posting_fixture.h"
#include "tests/support/library_double.h"

namespace {

using testing_support::LigneEssai;
using testing_support::OperationEssai;
using Strings = std::vector<std::string>;

class CreerPieceTest : public testing_support::PostingTest {
 protected:
  void echouer(const char* procedure, int occurrence, int code) {
    auto& hooks = services::importTestHooks();
    hooks.failProcedure = procedure;
    hooks.failOccurrence = occurrence;
    hooks.failCode = code;
    hooks.seen = 0;
  }

  testing_support::LibraryDouble import_{"CPPIECE-INTERFACE"};
};

TEST_F(CreerPieceTest, ClientInvoicePostsRowsAndCallsInOrder) {
  ecrire({.lignes = {{"706000", "100", "20", "V20", {{"ATELIER", "0", "60"}, {"CHANTIER", "0", "40"}}},
                     {"707000", "50", "10", "V20"}}});
  poster();

  EXPECT_EQ(appels_, (Strings{"DEBUT_IMPORT", "DEBUT_PIECE", "DEBUT_LIGNE 706000", "ANALYTIQUE", "ANALYTIQUE",
                              "FIN_LIGNE", "DEBUT_LIGNE 445800", "FIN_LIGNE", "DEBUT_LIGNE 707000", "FIN_LIGNE",
                              "DEBUT_LIGNE 445711", "FIN_LIGNE", "DEBUT_LIGNE 411001", "ECHEANCE", "FIN_LIGNE",
                              "FIN_PIECE", "FIN_IMPORT"}));
  std::string piece = npies();
  ASSERT_EQ(piece.size(), 11u);
  EXPECT_EQ(mouvements(piece),
            (Strings{"706000 C 100.00", "445800 C 20.00", "707000 C 50.00", "445711 C 10.00", "411001 D 180.00"}));
  EXPECT_EQ(sql("SELECT NPIEC || ' ' || NUMJL || ' ' || DTOPE || ' ' || CORIG FROM PIECE WHERE NPIES = '" + piece + "'"),
            "VT0042 VT 2024-03-15 *COMPTA*");
  EXPECT_EQ(compte("SELECT count(*) FROM MOUVE WHERE LIBEC <> 'Facture client n° VT0042'"), 0);
  // Each line keeps the identifier of its excluding-tax movement; the analytic rows
  // hang on the first one, the due date on the client's.
  EXPECT_EQ(compte("SELECT count(*) FROM MIRVAL JOIN MOUVE ON MOUVE.UNIQ = MIRVAL.MOUVE_UNIQ "
                   "WHERE MOUVE.NUMCP = MIRVAL.NUMCP"),
            2);
  EXPECT_EQ(sql("SELECT group_concat(CSECT || ' ' || MTACR, ', ') FROM VTSEC JOIN MOUVE ON MOUVE.UNIQ = VTSEC.MOUVE_UNIQ "
                "WHERE MOUVE.NUMCP = '706000'"),
            "ATELIER 60, CHANTIER 40");
  EXPECT_EQ(sql("SELECT MOUVE.NUMCP || ' ' || DTECH || ' ' || MTECH || ' ' || CTYPR || ' ' || NJLTR || ' ' || CTYEC "
                "|| ' ' || BPECH FROM ECHEA JOIN MOUVE ON MOUVE.UNIQ = ECHEA.UNIQ"),
            "411001 2024-04-14 180 30FM BQ1 FACT VIR");
  EXPECT_EQ(sql("SELECT INDX2 FROM MOUVE WHERE NUMCP = '411001'"), "411001|2024-03-15");
  for (const char* table : {"PIECE_IMM", "MOUVE_IMM", "ECHEA_IMM", "VTSEC_IMM"})
    EXPECT_EQ(compte(std::string("SELECT count(*) FROM ") + table), 0) << table;
  EXPECT_TRUE(messages().empty());
}

struct LineCase {
  const char* name;
  OperationEssai operation;
  Strings movements;
  const char* dueAmount;
};

TEST_F(CreerPieceTest, LinesMakeTheirMovements) {
  const LineCase cases[] = {
      {"HT zero: no movement, even with VAT",
       {.lignes = {{"706000", "0", "20", "V20"}, {"707000", "100", "20", "V20"}}, .ttc = "120"},
       {"707000 C 100.00", "445711 C 20.00", "411001 D 120.00"},
       "120"},
      {"no VAT: the excluding-tax movement only", {.lignes = {{"706000", "100"}}}, {"706000 C 100.00", "411001 D 100.00"}, "100"},
      {"no lines: the client movement and its due date", {.lignes = {}}, {"411001 D 0.00"}, "0"},
      {"credit note: revenue and VAT on debit, client on credit",
       {.lignes = {{"706000", "-100", "-20", "V20"}}},
       {"706000 D 100.00", "445800 D 20.00", "411001 C 120.00"},
       "120"},
      {"one VAT movement per line, not per code",
       {.lignes = {{"706000", "100", "20", "V20"}, {"706100", "50", "10", "V20"}}},
       {"706000 C 100.00", "445800 C 20.00", "706100 C 50.00", "445800 C 10.00", "411001 D 180.00"},
       "180"},
  };
  int n = 0;
  for (const LineCase& c : cases) {
    SCOPED_TRACE(c.name);
    OperationEssai op = c.operation;
    op.ident = "OP00000" + std::to_string(++n);
    ecrire(op);
    poster(op.ident);
    EXPECT_EQ(mouvements(npies(op.ident)), c.movements);
    EXPECT_EQ(sql("SELECT MTECH FROM ECHEA WHERE NPIES = '" + npies(op.ident) + "'"), c.dueAmount);
  }
  EXPECT_TRUE(messages().empty());
}

TEST_F(CreerPieceTest, OnlyTheExcludingTaxMovementCarriesTheLineVatCodeAndAnalyticCodes) {
  ecrire({.lignes = {{"706000", "100", "20", "V20"}, {"707000", "-50", "-5", "V10"}}});
  base().exec("UPDATE MIRVAL SET CPOST = 'POSTE' || substr(IDENT, -1), CCRIT = 'CLE' || substr(IDENT, -1)");
  poster();
  EXPECT_EQ(sql("SELECT group_concat(NUMCP || ':' || COTVA || ':' || CPOST || ':' || CCRIT, ' ') FROM "
                "(SELECT * FROM MOUVE ORDER BY NLIGS)"),
            "706000:V20:POSTE1:CLE1 445800::: 707000:V10:POSTE2:CLE2 445713::: 411001:::");
}

// One hand-computed operation per kind, each with a line the other way round: the
// sides, the VAT accounts, the counterpart and the due date of each kind.
TEST_F(CreerPieceTest, EachKindPostsItsSidesAccountsAndDueDate) {
  const struct {
    const char* name;
    OperationEssai operation;
    Strings movements;
    const char* dueDate;  // "ACCOUNT AMOUNT" of the due date, "" when the kind has none
  } cases[] = {
      {"client invoice",
       {.lignes = {{"706000", "100", "20", "V20"}, {"707100", "-50", "-10", "V20"}}},
       {"706000 C 100.00", "445800 C 20.00", "707100 D 50.00", "445800 D 10.00", "411001 D 60.00"},
       "411001 60"},
      {"supplier invoice: deductible VAT, even of a sales code",
       {.type = "FF", .lignes = {{"601000", "100", "20", "A20"}, {"602200", "-50", "-10", "V20"}}, .numcp = "401001",
        .numjl = "AC"},
       {"601000 D 100.00", "445660 D 20.00", "602200 C 50.00", "445660 C 10.00", "401001 C 60.00"},
       "401001 60"},
      {"expense note: as the supplier invoice",
       {.type = "NDF", .lignes = {{"601000", "100", "20", "A20"}, {"602200", "-50", "-10", "V20"}}, .numcp = "421001",
        .numjl = "AC"},
       {"601000 D 100.00", "445660 D 20.00", "602200 C 50.00", "445660 C 10.00", "421001 C 60.00"},
       "421001 60"},
      {"supplier credit note",
       {.type = "FF", .lignes = {{"601000", "-100", "-20", "A20"}}, .numcp = "401001", .numjl = "AC"},
       {"601000 C 100.00", "445660 C 20.00", "401001 D 120.00"},
       "401001 120"},
      {"bank receipt: sales VAT owed on debits unless said",
       {.type = "BQ", .lignes = {{"706000", "100", "20", "V20"}, {"707100", "-50", "-10", "V20"}}, .numcp = "512100",
        .numjl = "BQ1", .typeDr = "R"},
       {"706000 C 100.00", "445800 C 20.00", "707100 D 50.00", "445711 D 10.00", "512100 D 60.00"},
       ""},
      {"bank payment: deductible VAT",
       {.type = "BQ", .lignes = {{"601000", "100", "20", "V20"}, {"602200", "-50", "-10", "A20"}}, .numcp = "512100",
        .numjl = "BQ1", .typeDr = "D"},
       {"601000 D 100.00", "445660 D 20.00", "602200 C 50.00", "445660 C 10.00", "512100 C 60.00"},
       ""},
      {"cash payment",
       {.type = "CA", .lignes = {{"606400", "30", "6", "A20"}}, .numcp = "530000", .numjl = "CA", .typeDr = "D"},
       {"606400 D 30.00", "445660 D 6.00", "530000 C 36.00"},
       ""},
      // Each line on its own side; a VAT account takes the VAT amount; a line of only
      // a TTC makes a movement of zero; a line of no amount makes none.
      {"miscellaneous operation",
       {.type = "OD",
        .lignes = {{.numcp = "606100", .ht = "100", .tva = "20", .cotva = "A20", .sensDc = "D"},
                   {.numcp = "445711", .ht = "0", .tva = "30", .sensDc = "C"},
                   {.numcp = "658000", .ht = "0", .sensDc = "D", .ttc = "5"},
                   {.numcp = "758000", .ht = "0", .sensDc = "C"},
                   {.numcp = "512100", .ht = "90", .sensDc = "C"}},
        .numcp = "",
        .numjl = "OD"},
       {"606100 D 100.00", "445660 D 20.00", "445711 C 30.00", "658000 D 0.00", "512100 C 90.00"},
       ""},
  };
  int n = 0;
  for (const auto& c : cases) {
    SCOPED_TRACE(c.name);
    OperationEssai op = c.operation;
    op.ident = "OP00000" + std::to_string(++n);
    ecrire(op);
    poster(op.ident, op.type);
    std::string piece = npies(op.ident);
    EXPECT_EQ(mouvements(piece), c.movements);
    EXPECT_EQ(sql("SELECT MOUVE.NUMCP || ' ' || MTECH FROM ECHEA JOIN MOUVE ON MOUVE.UNIQ = ECHEA.UNIQ "
                  "WHERE ECHEA.NPIES = '" + piece + "'"),
              c.dueDate);
  }
  EXPECT_TRUE(messages().empty());
}

TEST_F(CreerPieceTest, VatAccountFollowsTheRuleOfEachKind) {
  // PARAM.PMTVA; the line account (706000 owes its VAT on receipts, 707000 on debits,
  // 707100 says nothing); the code's type (V20 sales, A20 purchases); the account taken
  // in CDTVA (V20: CITVA 445711, CETVA 445800, DETVA 445660).
  const struct {
    const char* type;
    const char* typeDr;
    const char* pmtva;
    const char* account;
    const char* cotva;
    const char* vatAccount;
  } cases[] = {
      {"FC", "", "D", "706000", "V20", "445711"}, {"FC", "", "E", "707000", "V20", "445800"},
      {"FC", "", "", "707000", "V20", "445711"},  {"FC", "", "", "706000", "V20", "445800"},
      {"FC", "", "", "707100", "V20", "445800"},  {"FF", "", "E", "707000", "V20", "445660"},
      {"NDF", "", "D", "706000", "V20", "445660"}, {"BQ", "D", "E", "706000", "V20", "445660"},
      {"BQ", "R", "E", "707000", "V20", "445800"}, {"CA", "R", "", "707100", "V20", "445711"},
      {"OD", "", "E", "706000", "A20", "445660"}, {"OD", "", "E", "707000", "V20", "445800"},
      {"OD", "", "D", "706000", "V20", "445711"}, {"OD", "", "", "706000", "V20", "445800"},
      {"OD", "", "", "707100", "V20", "445711"},
  };
  int n = 0;
  for (const auto& c : cases) {
    SCOPED_TRACE(std::string(c.type) + c.typeDr + " " + c.pmtva + " " + c.account + " " + c.cotva);
    base().exec(std::string("UPDATE PARAM SET PMTVA = '") + c.pmtva + "'");
    std::string type = c.type, ident = "OP0000" + std::to_string(10 + ++n);
    OperationEssai op{.ident = ident,
                      .type = type,
                      .lignes = {{.numcp = c.account, .ht = "100", .tva = "20", .cotva = c.cotva, .sensDc = "C"}},
                      .typeDr = c.typeDr};
    if (type == "OD") op.lignes.push_back({.numcp = "512100", .ht = "120", .sensDc = "D"});
    ecrire(op);
    poster(ident, type);
    Strings posted = mouvements(npies(ident));
    ASSERT_GE(posted.size(), 2u);
    EXPECT_EQ(posted[1].substr(0, 6), c.vatAccount);
  }
}

TEST_F(CreerPieceTest, MiscellaneousOperation) {
  // A line on a VAT account sends no analytic row, whatever the line holds.
  ecrire({.type = "OD",
          .lignes = {{.numcp = "445660", .ht = "0", .tva = "20", .ventilation = {{"ATELIER", "20", "0"}}, .sensDc = "D"},
                     {.numcp = "512100", .ht = "20", .sensDc = "C"}},
          .numcp = "",
          .numjl = "OD"});
  poster("OP000001", "OD");
  EXPECT_EQ(appels_, (Strings{"DEBUT_IMPORT", "DEBUT_PIECE", "DEBUT_LIGNE 445660", "FIN_LIGNE", "DEBUT_LIGNE 512100",
                              "FIN_LIGNE", "FIN_PIECE", "FIN_IMPORT"}));
  EXPECT_EQ(compte("SELECT count(*) FROM VTSEC"), 0);

  // Lines that do not balance never become a piece, and the user is told by how much.
  ecrire({.ident = "OP000002",
          .type = "OD",
          .lignes = {{.numcp = "512100", .ht = "100", .sensDc = "D"}, {.numcp = "512200", .ht = "90", .sensDc = "C"}},
          .numcp = "",
          .numjl = "OD"});
  poster("OP000002", "OD");
  EXPECT_EQ(messages(), (Strings{"Erreur lors validation de la pièce :@La pièce n'est pas équilibrée : débit "
                                 "100.00, crédit 90.00."}));
  EXPECT_EQ(compte("SELECT count(*) FROM PIECE"), 1);
}

TEST_F(CreerPieceTest, FailedLineEndsTheLinesButNotThePiece) {
  ecrire({.lignes = {{"706000", "100", "20", "V20"}, {"707000", "100", "20", "V20"}, {"706100", "100", "20", "V20"}}});
  echouer("DEBUT_LIGNE", 3, 7);  // the second line's excluding-tax movement
  poster();

  EXPECT_EQ(lignesEnvoyees(), (Strings{"706000", "445800", "707000", "411001"}));
  Strings fin(appels_.end() - 7, appels_.end());
  EXPECT_EQ(fin, (Strings{"DEBUT_LIGNE 411001", "ECHEANCE", "FIN_LIGNE", "FIN_PIECE", "POSDEBUT_ERREUR",
                          "ERREUR_SUIVANTE", "ERREUR_SUIVANTE"}));
  // What was sent no longer balances: the ledger refuses it whole.
  EXPECT_EQ(messages(), (Strings{"Erreur lors validation de la pièce :@La pièce n'est pas équilibrée : débit "
                                 "360.00, crédit 120.00."}));
  EXPECT_EQ(compte("SELECT count(*) FROM PIECE"), 0);
  EXPECT_EQ(compte("SELECT count(*) FROM MOUVE"), 0);
}

TEST_F(CreerPieceTest, AFailedAnalyticRowEndsItsLineAndAFailedDueDateEndsThePiece) {
  const struct {
    const char* procedure;
    Strings tail;  // the calls from the failed one on
  } cases[] = {
      // One analytic call only, the line ended, the next lines still sent.
      {"ANALYTIQUE",
       {"ANALYTIQUE", "FIN_LIGNE", "DEBUT_LIGNE 445800", "FIN_LIGNE", "DEBUT_LIGNE 411001", "ECHEANCE", "FIN_LIGNE",
        "FIN_PIECE"}},
      // Nothing is sent after the due date.
      {"ECHEANCE", {"ECHEANCE", "FIN_PIECE"}},
  };
  int n = 0;
  for (const auto& c : cases) {
    SCOPED_TRACE(c.procedure);
    std::string ident = "OP00001" + std::to_string(++n);
    ecrire({.ident = ident,
            .lignes = {{"706000", "100", "20", "V20", {{"ATELIER", "0", "60"}, {"CHANTIER", "0", "40"}}}}});
    appels_.clear();
    echouer(c.procedure, 1, 7);
    poster(ident);
    auto from = std::find(appels_.begin(), appels_.end(), c.procedure);
    ASSERT_NE(from, appels_.end());
    Strings sent(from, std::find(from, appels_.end(), "FIN_PIECE") + 1);
    EXPECT_EQ(sent, c.tail);
  }
}

TEST_F(CreerPieceTest, TheDueDateHangsOnTheTiersMovementOfItsOwnPiece) {
  ecrire({.ident = "OP000001", .lignes = {{"706000", "100"}}});
  poster("OP000001");
  ecrire({.ident = "OP000002", .lignes = {{"706000", "50"}, {"707000", "30"}}});
  poster("OP000002");
  std::string second = npies("OP000002");
  EXPECT_EQ(sql("SELECT ECHEA.INDX1 = MOUVE.UNIQ FROM ECHEA JOIN MOUVE ON MOUVE.NPIES = ECHEA.NPIES "
                "WHERE MOUVE.NUMCP = '411001' AND ECHEA.NPIES = '" + second + "'"),
            "1");
  EXPECT_NE(sql("SELECT INDX1 FROM ECHEA WHERE NPIES = '" + second + "'"), "1");
}

TEST_F(CreerPieceTest, TheProcessClearsOutTheTransferRowsOnceTheyAreConsumed) {
  // The component's own end of the import would hide whether the process clears out
  // after itself: that end is put off until the user action ends.
  auto rows = [this] {
    std::map<std::string, long long> count;
    for (const char* table : {"PIECE_IMM", "MOUVE_IMM", "ECHEA_IMM", "VTSEC_IMM"})
      count[table] = compte(std::string("SELECT count(*) FROM ") + table);
    return count;
  };
  std::map<std::string, long long> atFinPiece, left;
  import_.answers["FIN_PIECE"] = [&](host::Automate& real, host::Evt* e) {
    atFinPiece = rows();
    real.executer("FIN_PIECE", e);
    return real.erreurMethode();
  };
  import_.answers["FIN_IMPORT"] = [](host::Automate&, host::Evt*) { return 0; };
  import_.atEndOfUnit = [&](host::Automate& real) {
    left = rows();
    real.executer("FIN_IMPORT", nullptr);
  };
  ecrire({.lignes = {{"706000", "100", "20", "V20", {{"ATELIER", "0", "100"}}}}});
  poster();

  EXPECT_EQ(atFinPiece["ECHEA_IMM"], 0) << "the due date goes once its movement is closed";
  EXPECT_EQ(left["PIECE_IMM"], 0);
  EXPECT_EQ(left["MOUVE_IMM"], 0);
  EXPECT_EQ(left["ECHEA_IMM"], 0);
  EXPECT_GT(left["VTSEC_IMM"], 0) << "what the process leaves must still show";
  EXPECT_EQ(import_.calls.back(), "FIN_IMPORT");
  EXPECT_EQ(compte("SELECT count(*) FROM PIECE"), 1);
}

TEST_F(CreerPieceTest, NpiesReplacedAsSoonAsDebutPieceSucceeds) {
  ecrire({.lignes = {{"706000", "100", "20", "V20"}}, .npies = "00000000999"});
  std::string seenAtFirstLine;
  services::importTestHooks().onCall = [&](const std::string& procedure, const std::string&) {
    if (procedure == "DEBUT_LIGNE" && seenAtFirstLine.empty()) seenAtFirstLine = npies();
  };
  echouer("FIN_PIECE", 1, 3);
  poster();
  EXPECT_NE(seenAtFirstLine, "00000000999");
  EXPECT_EQ(npies(), seenAtFirstLine);
  EXPECT_EQ(compte("SELECT count(*) FROM PIECE"), 0);

  // A header the ledger never took leaves the operation on its former piece.
  ecrire({.ident = "OP000002", .lignes = {{"706000", "100"}}, .npies = "00000000999"});
  echouer("DEBUT_PIECE", 1, 3);
  poster("OP000002");
  EXPECT_EQ(npies("OP000002"), "00000000999");
}

TEST_F(CreerPieceTest, ABankLineWithAJustifiedDueDateIsNotPostedWithoutItsSettlement) {
  ecrire({.type = "BQ", .lignes = {{"411001", "120"}, {"706000", "30"}}, .numcp = "512100", .numjl = "BQ1",
          .typeDr = "R"});
  // Due date 42 of the client is justified on the first line; the second has none.
  sql("INSERT INTO MIRVAJUS (IDENTR, NUSYS, MTREG) SELECT IDENT, 42, '120' FROM MIRVAL WHERE NUMCP = '411001'");
  poster("OP000001", "BQ");
  std::vector<std::string> errors = session().transcript().textes("erreur");
  ASSERT_FALSE(errors.empty());
  EXPECT_NE(errors.back().find("L'échéance n° 42 est justifiée sur cette opération"), std::string::npos)
      << errors.back();
  EXPECT_EQ(compte("SELECT count(*) FROM PIECE"), 0);
  EXPECT_EQ(compte("SELECT count(*) FROM MOUVE"), 0);

  sql("DELETE FROM MIRVAJUS");
  poster("OP000001", "BQ");
  EXPECT_EQ(compte("SELECT count(*) FROM PIECE"), 1);
}

TEST_F(CreerPieceTest, LedgerUnreachableStopsWithOneMessage) {
  ecrire({.lignes = {{"706000", "100", "20", "V20"}}});
  echouer("DEBUT_IMPORT", 1, 1);
  poster();
  EXPECT_EQ(appels_, Strings{"DEBUT_IMPORT"});
  EXPECT_EQ(messages(), Strings{"La connexion à la comptabilité est impossible !"});
  EXPECT_EQ(npies(), "");
}

TEST_F(CreerPieceTest, ErrorTextsShownOneBoxEachForCodeTenOnly) {
  // Refused by the ledger (code 10): one box per text, in the ledger's order.
  ecrire({.lignes = {{"709999", "100"}}, .numjl = "ZZ"});
  poster();
  EXPECT_EQ(messages(), (Strings{"Erreur lors validation de la pièce :@Le journal « ZZ » n'existe pas.",
                                 "Erreur lors validation de la pièce :@Mouvement 1 : le compte « 709999 » n'existe pas."}));

  // Any other code: nothing shown, texts not even asked for.
  session().transcript().vider();
  appels_.clear();
  ecrire({.ident = "OP000002", .lignes = {{"706000", "100"}}});
  echouer("FIN_PIECE", 1, 3);
  poster("OP000002");
  EXPECT_TRUE(messages().empty());
  EXPECT_EQ(appels_.back(), "FIN_PIECE");
}

TEST_F(CreerPieceTest, MissingHeaderOrParametersOrAnotherKindPostNothing) {
  poster("INCONNU");
  EXPECT_TRUE(appels_.empty());
  // A supplier invoice handed to the client-invoice posting would post reversed.
  ecrire({.ident = "OP000009", .lignes = {{"601000", "100"}}, .numcp = "401001", .numjl = "AC"});
  base().exec("UPDATE MIRVAE SET TYPE = 'FF' WHERE IDENT = 'OP000009'");
  poster("OP000009");
  EXPECT_TRUE(appels_.empty());
  EXPECT_EQ(npies("OP000009"), "");
  ASSERT_FALSE(messages().empty());
  EXPECT_EQ(messages().back(),
            "L'opération OP000009 est de type « FF » : elle ne peut être comptabilisée comme une opération de type "
            "« FC ».");
  ecrire({.lignes = {{"706000", "100"}}});
  base().exec("DELETE FROM PARAM");
  poster();
  EXPECT_TRUE(appels_.empty());
  EXPECT_EQ(npies(), "");
}

}  // namespace
