#include <algorithm>
#include <map>

#include <gtest/gtest.h>

#include "host/currency.h"
#include "host/decimal.h"
#include "services/cppiece.h"
#include "tests/posting/posting_fixture.h"
#include "tests/support/library_double.h"

namespace {

using testing_support::LigneEssai;
using testing_support::OperationEssai;
using Strings = std::vector<std::string>;
using host::Decimal;

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
      // A credit note's sides and one VAT movement per line: with each kind, below.
      {"credit note: the client on credit, its due date of the amount",
       {.lignes = {{"706000", "-100", "-20", "V20"}}},
       {"706000 D 100.00", "445800 D 20.00", "411001 C 120.00"},
       "120"},
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

// Invoices posted, then settled by bank lines whose justification rows hold what the
// justification screen computes: the settled amount at the settlement rate, and the
// exchange difference against the invoice's rate.
class ReglementTest : public CreerPieceTest {
 protected:
  struct Facture {
    std::string ident, type, numcp, montant, monnaie, cours;
  };
  // Posts the invoice and gives the system number of its due date.
  std::string facturer(const Facture& f) {
    ecrire({.ident = f.ident, .type = f.type, .lignes = {{f.type == "FC" ? "706000" : "601000", f.montant}},
            .numcp = f.numcp, .numjl = f.type == "FC" ? "VT" : "AC", .monnaie = f.monnaie, .cours = f.cours});
    poster(f.ident, f.type);
    return sql("SELECT NUSYS FROM ECHEA WHERE NPIES = '" + npies(f.ident) + "' AND UNIQR = 0");
  }
  // A bank operation of one line on `numcp` settling `echeance` for the whole line,
  // receipt ("R") or payment ("D"), posted.
  void regler(const std::string& ident, const std::string& typeDr, const std::string& numcp,
              const std::string& echeance, const std::string& montant, const std::string& monnaie,
              const std::string& cours, const std::string& coursFacture) {
    ecrire({.ident = ident, .type = "BQ", .lignes = {{numcp, montant}}, .numcp = "512100", .numjl = "BQ1",
            .monnaie = monnaie, .cours = cours, .typeDr = typeDr});
    host::Devises& devises = host::euro();
    Decimal regs = *Decimal::parse(montant);
    auto enEuros = [&](const std::string& rate) {
      return monnaie == "EUR" ? regs : devises.reprice(regs, *Decimal::parse(rate), Decimal(1), "EUR");
    };
    Decimal reg = enEuros(cours), ecart = monnaie == "EUR" ? Decimal() : enEuros(coursFacture) - reg;
    sql("INSERT INTO MIRVAJUS (IDENTR, NUSYS, MTREG, MTREGS, MTECHG) VALUES ('" + ident + "-1', " + echeance + ", '" +
        reg.toString(2) + "', '" + montant + "', '" + ecart.toString(2) + "')");
    poster(ident, "BQ");
  }
  // The account's balance in euros, summed exactly.
  std::string solde(const std::string& numcp) {
    Decimal total;
    host::Statement& s = base().prepare("SELECT MTDEB, MTCRE FROM MOUVE WHERE NUMCP = ?");
    s.bind(1, numcp);
    while (s.step()) total += *Decimal::parse(s.text(0)) - *Decimal::parse(s.text(1));
    s.reset();
    return total.toString(2);
  }
};

// A full settlement leaves the tiers account at exactly 0 in euros, the due date paid
// and closed, every movement of the invoice lettered together; an exchange difference
// goes to the exchange journal, on the gain or loss account by its side.
TEST_F(ReglementTest, AFullSettlementClosesTheInvoiceAndBooksItsExchangeDifference) {
  struct Case {
    const char* name;
    Facture facture;
    const char* typeDr;
    const char* coursReglement;
    Strings ecart;  // the movements of the exchange piece
  };
  const Case cases[] = {
      {"euros", {"F1", "FC", "411001", "1200", "EUR", "1"}, "R", "1", {}},
      {"dollar plus cher à l'encaissement : gain",
       {"F2", "FC", "411002", "1000", "USD", "1.10"}, "R", "1.05",
       {"411002 D 43.29", "766000 C 43.29"}},
      {"dollar moins cher à l'encaissement : perte",
       {"F3", "FC", "411003", "1000", "USD", "1.05"}, "R", "1.10",
       {"411003 C 43.29", "666000 D 43.29"}},
      {"fournisseur payé en dollars plus chers : perte",
       {"F4", "FF", "401001", "1000", "USD", "1.10"}, "D", "1.05",
       {"401001 C 43.29", "666000 D 43.29"}},
  };
  int n = 0;
  for (const Case& c : cases) {
    SCOPED_TRACE(c.name);
    std::string nusys = facturer(c.facture);
    ASSERT_FALSE(nusys.empty());
    std::string reglement = "R" + std::to_string(++n);
    regler(reglement, c.typeDr, c.facture.numcp, nusys, c.facture.montant, c.facture.monnaie, c.coursReglement,
           c.facture.cours);
    ASSERT_FALSE(npies(reglement).empty()) << testing::PrintToString(session().transcript().textes("erreur"));
    EXPECT_EQ(solde(c.facture.numcp), "0.00");
    EXPECT_EQ(sql("SELECT (UNIQR <> 0) || ' ' || MTRES || ' ' || MTRESS FROM ECHEA WHERE NUSYS = " + nusys), "1 0 0");
    EXPECT_EQ(sql("SELECT count(DISTINCT RELET) || ' ' || min(RELET = upper(RELET) AND DTLET <> '') FROM MOUVE "
                  "WHERE NUMCP = '" + c.facture.numcp + "'"),
              "1 1");
    std::string ecart = sql("SELECT NPIES FROM PIECE WHERE NUMJL = 'ODC' AND NPIES > '" + npies(reglement) + "'");
    EXPECT_EQ(ecart.empty() ? Strings{} : mouvements(ecart), c.ecart);
  }
  EXPECT_EQ(sql("SELECT count(*) FROM EAEUR"), "0");
}

// Dollar invoices paid in several parts at many rates: each part leaves a due date for
// the rest, still offered; the last one leaves not one cent on the tiers account.
TEST_F(ReglementTest, PartialPaymentsAtManyRatesLeaveNoResidualCent) {
  struct Case {
    const char* montant;
    const char* coursFacture;
    std::vector<std::pair<const char*, const char*>> parts;  // amount, rate
  };
  const Case cases[] = {
      {"1000.01", "1.1", {{"333.33", "1.2"}, {"333.33", "1.05"}, {"333.35", "0.97"}}},
      {"99.99", "1.3194", {{"0.01", "1.1"}, {"99.98", "1.2271"}}},
      {"12345.67", "1.0387", {{"5000", "1.1050"}, {"7000", "1.1"}, {"345.67", "1.0666"}}},
  };
  int n = 0;
  for (const Case& c : cases) {
    std::string facture = "F" + std::to_string(++n), client = "41100" + std::to_string(n);
    SCOPED_TRACE(facture);
    std::string nusys = facturer({facture, "FC", client, c.montant, "USD", c.coursFacture});
    for (std::size_t p = 0; p < c.parts.size(); ++p) {
      std::string reglement = facture + "R" + std::to_string(p);
      regler(reglement, "R", client, nusys, c.parts[p].first, "USD", c.parts[p].second, c.coursFacture);
      ASSERT_FALSE(npies(reglement).empty()) << testing::PrintToString(session().transcript().textes("erreur"));
      nusys = sql("SELECT NUSYS FROM ECHEA WHERE NPIES = '" + npies(facture) + "' AND UNIQR = 0");
      bool last = p + 1 == c.parts.size();
      EXPECT_EQ(nusys.empty(), last);
      // Until the last part the invoice stays unlettered, so that its rest is offered.
      EXPECT_EQ(sql("SELECT RELET <> '' FROM MOUVE WHERE NUMCP = '" + client + "' AND NPIES = '" + npies(facture) +
                    "'"),
                last ? "1" : "0");
    }
    EXPECT_EQ(solde(client), "0.00");
    EXPECT_EQ(sql("SELECT sum(MTPAYS) FROM ECHEA WHERE NPIES = '" + npies(facture) + "'"),
              Decimal::parse(c.montant)->toString(0));
  }
}

// One payment that closes an invoice and the rest of another, partly paid before,
// joins both settlements into one lettering, which balances to the cent.
TEST_F(ReglementTest, APaymentOfTwoInvoicesLettersThemTogether) {
  std::string a = facturer({"FA", "FC", "411001", "100", "USD", "1.1"});
  std::string b = facturer({"FB", "FC", "411001", "200", "USD", "1.2"});
  regler("R1", "R", "411001", a, "50", "USD", "1.3", "1.1");
  std::string rest = sql("SELECT NUSYS FROM ECHEA WHERE NPIES = '" + npies("FA") + "' AND UNIQR = 0");
  ecrire({.ident = "R2", .type = "BQ", .lignes = {{"411001", "250"}}, .numcp = "512100", .numjl = "BQ1",
          .monnaie = "USD", .cours = "0.9", .typeDr = "R"});
  // Settled at 0.9: 200 USD are 222.22 EUR against 166.67, 50 USD 55.56 against 45.45.
  sql("INSERT INTO MIRVAJUS (IDENTR, NUSYS, MTREG, MTREGS, MTECHG) VALUES ('R2-1', " + b +
      ", '222.22', '200', '-55.55'), ('R2-1', " + rest + ", '55.56', '50', '-10.11')");
  poster("R2", "BQ");
  ASSERT_FALSE(npies("R2").empty()) << testing::PrintToString(session().transcript().textes("erreur"));
  EXPECT_EQ(solde("411001"), "0.00");
  EXPECT_EQ(sql("SELECT count(DISTINCT RELET) || ' ' || min(RELET = upper(RELET) AND RELET <> '') FROM MOUVE "
                "WHERE NUMCP = '411001'"),
            "1 1");
  EXPECT_EQ(sql("SELECT count(DISTINCT RELET) FROM ECHEA WHERE NPIES IN ('" + npies("FA") + "', '" + npies("FB") +
                "')"),
            "1");
}

// What cannot be settled stops the posting whole: no piece, no settlement, no
// difference, and the reason said.
TEST_F(ReglementTest, ASettlementThatCannotBeMadePostsNothing) {
  std::string nusys = facturer({"F1", "FC", "411001", "1200", "EUR", "1"});
  std::string uniq = sql("SELECT UNIQ FROM ECHEA WHERE NUSYS = " + nusys);
  struct Case {
    const char* name;
    std::string before, after;  // the ledger as the bank line finds it, and put back
    const char* message;
  };
  const Case cases[] = {
      {"déjà réglée", "UPDATE ECHEA SET UNIQR = 999", "UPDATE ECHEA SET UNIQR = 0", "est déjà réglée"},
      {"disparue", "UPDATE ECHEA SET NUSYS = 777", "UPDATE ECHEA SET NUSYS = " + nusys, "n'existe plus"},
      {"mouvement illisible", "UPDATE ECHEA SET UNIQ = 555", "UPDATE ECHEA SET UNIQ = " + uniq,
       "Lecture impossible sur < MOUVE1.UNIQ,EgalA,ECHEA.UNIQ > = 555"},
  };
  std::string ledger = sql("SELECT group_concat(NUSYS || UNIQ || UNIQR || MTRES) FROM ECHEA");
  int n = 0;
  for (const Case& c : cases) {
    SCOPED_TRACE(c.name);
    base().exec(c.before);
    std::string reglement = "R" + std::to_string(++n);
    session().transcript().vider();
    regler(reglement, "R", "411001", nusys, "1200", "EUR", "1", "1");
    Strings errors = session().transcript().textes("erreur");
    ASSERT_FALSE(errors.empty());
    EXPECT_NE(errors.back().find(c.message), std::string::npos) << errors.back();
    EXPECT_EQ(sql("SELECT count(*) FROM PIECE WHERE NUMJL = 'BQ1'"), "0");
    EXPECT_EQ(sql("SELECT count(*) FROM MOUVE WHERE RELET <> ''"), "0");
    base().exec(c.after);
    EXPECT_EQ(sql("SELECT group_concat(NUSYS || UNIQ || UNIQR || MTRES) FROM ECHEA"), ledger);
  }
}

// Once settled, neither the invoice nor the bank operation may be changed: the
// invoice is (partly) paid, the bank movement is lettered.
TEST_F(ReglementTest, ASettledInvoiceAndItsSettlementRefuseModification) {
  std::string nusys = facturer({"F1", "FC", "411001", "1200", "EUR", "1"});
  regler("R1", "R", "411001", nusys, "200", "EUR", "1", "1");
  for (const auto& [ident, message] :
       std::vector<std::pair<std::string, std::string>>{{"F1", "partiellement réglée"}, {"R1", "lettré ou pointé"}}) {
    session().transcript().vider();
    host::Entier flag(0);
    host::Chaine piece(npies(ident));
    host::EvtParamRef evt(2, &flag, &piece);
    lancer("MIRVAE-VERIFIER_MODIF_PIECE", evt);
    EXPECT_EQ(flag.entier(), 1) << ident;
    ASSERT_FALSE(messages().empty()) << ident;
    EXPECT_NE(messages().back().find(message), std::string::npos) << messages().back();
  }
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
