#include "posting/creer_piece_fc.h"

#include <algorithm>
#include <map>

#include <gtest/gtest.h>

#include "host/registry.h"
#include "services/cppiece.h"
#include "tests/posting/posting_fixture.h"
#include "tests/support/library_double.h"

namespace {

using testing_support::LigneEssai;
using testing_support::OperationEssai;
using Strings = std::vector<std::string>;

class CreerPieceFcTest : public testing_support::PostingTest {
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

TEST_F(CreerPieceFcTest, ClientInvoicePostsRowsAndCallsInOrder) {
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

TEST_F(CreerPieceFcTest, LinesMakeTheirMovements) {
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

TEST_F(CreerPieceFcTest, OnlyTheExcludingTaxMovementCarriesTheLineVatCodeAndAnalyticCodes) {
  ecrire({.lignes = {{"706000", "100", "20", "V20"}, {"707000", "-50", "-5", "V10"}}});
  base().exec("UPDATE MIRVAL SET CPOST = 'POSTE' || substr(IDENT, -1), CCRIT = 'CLE' || substr(IDENT, -1)");
  poster();
  EXPECT_EQ(sql("SELECT group_concat(NUMCP || ':' || COTVA || ':' || CPOST || ':' || CCRIT, ' ') FROM "
                "(SELECT * FROM MOUVE ORDER BY NLIGS)"),
            "706000:V20:POSTE1:CLE1 445800::: 707000:V10:POSTE2:CLE2 445713::: 411001:::");
}

TEST_F(CreerPieceFcTest, VatAccountFollowsTheDossierThenTheLineAccount) {
  struct Case {
    const char* pmtva;
    const char* account;  // 706000 owes its VAT on receipts, 707000 on debits, 707100 says nothing
    const char* vatAccount;
  } cases[] = {{"D", "706000", "445711"},
               {"E", "707000", "445800"},
               {"", "707000", "445711"},
               {"", "706000", "445800"},
               {"", "707100", "445800"}};
  int n = 0;
  for (const Case& c : cases) {
    SCOPED_TRACE(std::string(c.pmtva) + " " + c.account);
    base().exec(std::string("UPDATE PARAM SET PMTVA = '") + c.pmtva + "'");
    std::string ident = "OP00000" + std::to_string(++n);
    ecrire({.ident = ident, .lignes = {{c.account, "100", "20", "V20"}}});
    poster(ident);
    EXPECT_EQ(mouvements(npies(ident))[1], std::string(c.vatAccount) + " C 20.00");
  }
}

TEST_F(CreerPieceFcTest, FailedLineEndsTheLinesButNotThePiece) {
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

TEST_F(CreerPieceFcTest, AFailedAnalyticRowEndsItsLineAndAFailedDueDateEndsThePiece) {
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

TEST_F(CreerPieceFcTest, TheDueDateHangsOnTheTiersMovementOfItsOwnPiece) {
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

TEST_F(CreerPieceFcTest, TheProcessClearsOutTheTransferRowsOnceTheyAreConsumed) {
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

TEST_F(CreerPieceFcTest, NpiesReplacedAsSoonAsDebutPieceSucceeds) {
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

TEST_F(CreerPieceFcTest, LedgerUnreachableStopsWithOneMessage) {
  ecrire({.lignes = {{"706000", "100", "20", "V20"}}});
  echouer("DEBUT_IMPORT", 1, 1);
  poster();
  EXPECT_EQ(appels_, Strings{"DEBUT_IMPORT"});
  EXPECT_EQ(messages(), Strings{"La connexion à la comptabilité est impossible !"});
  EXPECT_EQ(npies(), "");
}

TEST_F(CreerPieceFcTest, ErrorTextsShownOneBoxEachForCodeTenOnly) {
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

TEST_F(CreerPieceFcTest, MissingHeaderOrParametersOrAnotherKindPostNothing) {
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

TEST_F(CreerPieceFcTest, RegisteredInItsUnitBetweenGlobalAndSource) {
  const auto& all = host::Registre::instance().declarations();
  auto at = [&](const char* name) {
    for (std::size_t i = 0; i < all.size(); ++i)
      if (all[i].sorte == host::Declaration::kModule && all[i].name == name) return i;
    return all.size();
  };
  std::size_t creer = at("MIRVAE-CREER_PIECE_FC"), supprimer = at("MIRVAE-SUPPRIMER_PIECE"),
              verifier = at("MIRVAE-VERIFIER_MODIF_PIECE");
  ASSERT_LT(verifier, all.size());
  ASSERT_GT(creer, 0u);
  EXPECT_LT(creer, supprimer);
  EXPECT_LT(supprimer, verifier);
  EXPECT_EQ(all[creer - 1].sorte, host::Declaration::kGlobal);
  EXPECT_EQ(all[creer - 1].name, "MIRVAE");
  EXPECT_EQ(all[verifier + 1].sorte, host::Declaration::kSource);
  EXPECT_EQ(all[verifier + 1].name, "MIRVAE");
  EXPECT_EQ(all[creer].label, "");
}

}  // namespace
