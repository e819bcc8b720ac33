// The `mirvae` program itself, run as a person runs it: session scripts through
// `mirvae run` on a fresh demo dossier, the demo, and --help on every command.
#include <gtest/gtest.h>
#include <sqlite3.h>
#include <sys/wait.h>

#include <cstdio>
#include <filesystem>
#include <fstream>
#include <sstream>

#include "host/text.h"
#include "tests/support/fixture.h"

namespace {

struct Outcome {
  int status;
  std::string out;  // standard output and error together
};

// Runs a shell command and keeps what it printed.
Outcome run(const std::string& command_line) {
  std::string command = command_line + " 2>&1";
  FILE* pipe = ::popen(command.c_str(), "r");
  if (!pipe) return {-1, "popen"};
  std::string out;
  char buffer[4096];
  for (std::size_t n; (n = std::fread(buffer, 1, sizeof buffer, pipe)) > 0;) out.append(buffer, n);
  int status = ::pclose(pipe);
  return {WIFEXITED(status) ? WEXITSTATUS(status) : -1, out};
}

Outcome mirvae(const std::string& args) { return run(std::string("'") + MIRVAE_BINARY + "' " + args); }

std::string quote(const std::string& path) { return "'" + path + "'"; }

// Writes into a dossier behind the program's back, as a person with sqlite3 would.
void writeBehind(const std::string& dossier, const std::string& sql) {
  sqlite3* db = nullptr;
  ASSERT_EQ(sqlite3_open(dossier.c_str(), &db), SQLITE_OK);
  char* error = nullptr;
  EXPECT_EQ(sqlite3_exec(db, sql.c_str(), nullptr, nullptr, &error), SQLITE_OK) << (error ? error : "");
  sqlite3_free(error);
  sqlite3_close(db);
}

std::string contents(const std::string& path) {
  std::ifstream in(path);
  return {std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>()};
}

class MirvaeRunTest : public ::testing::Test {
 protected:
  void SetUp() override {
    dossier_ = testing_support::cheminTemporaire("mirvae-run");
    script_ = testing_support::cheminTemporaire("mirvae-script") + ".txt";
    Outcome init = mirvae("init --demo " + quote(dossier_));
    ASSERT_EQ(init.status, 0) << init.out;
  }
  void TearDown() override {
    for (const auto& path : {dossier_, script_, other_})
      for (const char* suffix : {"", "-wal", "-shm"}) std::filesystem::remove(path + suffix);
  }
  Outcome play(const std::string& text) {
    std::ofstream(script_) << text;
    return mirvae("run " + quote(dossier_) + " " + quote(script_));
  }
  bool registered(const std::string& module) {
    std::istringstream names(mirvae("modules").out);
    for (std::string name; std::getline(names, name);)
      if (name == module) return true;
    return false;
  }

  std::string dossier_, script_, other_;
};

TEST_F(MirvaeRunTest, PlaysASessionOnAFreshDemoDossierEndToEnd) {
  // The client-invoice list when the library has it; the dossier's own data always.
  std::string screen = registered("MIRVAE-ACCES1") ? "open MIRVAE-ACCES1\n"
                                                     "expect screen MIRVAE-ACCES1\n"
                                                     "expect no error\n"
                                                     "close\n"
                                                   : "";
  Outcome run = play("# une session\ntoday 15/03/2024 10:30\n" + screen +
                 "expect sql \"SELECT count(*) FROM COMPT WHERE NUMCP LIKE '512%'\" = 2\n"
                 "expect sql \"SELECT count(*) FROM PIECE\" = 0\n");
  EXPECT_EQ(run.status, 0) << run.out;
  if (!screen.empty()) {
    EXPECT_NE(run.out.find("[ouvre] MIRVAE-ACCES1"), std::string::npos) << run.out;
    EXPECT_NE(run.out.find("[ferme] MIRVAE-ACCES1"), std::string::npos) << run.out;
  }
}

TEST_F(MirvaeRunTest, AFailingExpectationExitsNonZeroNamingItsLine) {
  Outcome run = play("today 15/03/2024\n\nexpect sql \"SELECT count(*) FROM COMPT WHERE NUMCP LIKE '512%'\" = 3\n"
                 "expect sql \"SELECT 1\" = 1\n");
  EXPECT_EQ(run.status, 1) << run.out;
  EXPECT_NE(run.out.find(script_ + ":3: expect sql"), std::string::npos) << run.out;
  EXPECT_NE(run.out.find("la requête donne « 2 », attendu « 3 »"), std::string::npos) << run.out;
}

TEST_F(MirvaeRunTest, ALineThatCannotBeUnderstoodExitsNonZeroNamingItsLine) {
  Outcome run = play("today 15/03/2024\nappuyer VALIDER\n");
  EXPECT_EQ(run.status, 1) << run.out;
  EXPECT_NE(run.out.find(script_ + ":2: appuyer VALIDER : instruction inconnue"), std::string::npos) << run.out;
}

TEST_F(MirvaeRunTest, AMissingScriptOrDossierIsRefused) {
  EXPECT_NE(mirvae("run " + quote(dossier_) + " /nonexistent/script.txt").status, 0);
  std::ofstream(script_) << "today 15/03/2024\n";
  EXPECT_NE(mirvae("run /nonexistent/dossier.db " + quote(script_)).status, 0);
}

TEST_F(MirvaeRunTest, TheDemoMakesItsDossierAndNeverReplacesAnotherFile) {
  other_ = testing_support::cheminTemporaire("mirvae-demo");
  // The demo holds its own expectations: the invoice, its modification and the
  // credit note are posted as the screens promise.
  Outcome demo = mirvae("demo --dossier " + quote(other_));
  EXPECT_EQ(demo.status, 0) << demo.out;
  EXPECT_NE(demo.out.find("[ouvre] MIRVAE-GESTION1"), std::string::npos) << demo.out;
  EXPECT_NE(demo.out.find("Le dossier de démonstration est "), std::string::npos) << demo.out;
  EXPECT_TRUE(std::filesystem::exists(other_));
  // Played again, it starts from a fresh dossier: same result.
  Outcome again = mirvae("demo --dossier " + quote(other_));
  EXPECT_EQ(again.status, 0) << again.out;

  // Its ledger, exported, is a journal hledger accepts, and every piece balances.
  std::string journal = other_ + ".journal";
  Outcome exported = mirvae("export " + quote(other_) + " --format hledger -o " + quote(journal));
  EXPECT_EQ(exported.status, 0) << exported.out;
  if (std::system("command -v hledger >/dev/null 2>&1") == 0) {
    Outcome check = run("hledger -f " + quote(journal) + " check");
    EXPECT_EQ(check.status, 0) << check.out;
    Outcome balance = run("hledger -f " + quote(journal) + " balance --no-elide");
    EXPECT_EQ(balance.status, 0) << balance.out;
    // The last line is the grand total: nothing, when debits and credits match.
    std::string total = balance.out.substr(balance.out.find_last_of('-') + 1);
    EXPECT_EQ(total.find_first_not_of(" \n0"), std::string::npos) << balance.out;
    // The bank account holds what its browser showed after the receipt: 1464.00, "D".
    Outcome bank = run("hledger -f " + quote(journal) + " balance 512100 --no-total");
    EXPECT_NE(bank.out.find("1464.00 EUR  512100"), std::string::npos) << bank.out;
  }
  std::filesystem::remove(journal);

  std::filesystem::remove(other_);
  std::ofstream(other_) << "mes notes\n";
  Outcome refused = mirvae("demo --dossier " + quote(other_));
  EXPECT_NE(refused.status, 0);
  EXPECT_NE(refused.out.find("n'est pas un dossier"), std::string::npos) << refused.out;
  std::ifstream kept(other_);
  std::string text;
  std::getline(kept, text);
  EXPECT_EQ(text, "mes notes");
}

TEST_F(MirvaeRunTest, AnInitKilledHalfWayLeavesNothingInTheWayOfTheNext) {
  other_ = testing_support::cheminTemporaire("mirvae-init");
  // The system kills a process that writes past its file size limit: here, half-way
  // through the dossier.
  Outcome killed = run("ulimit -f 16; '" + std::string(MIRVAE_BINARY) + "' init --demo " + quote(other_));
  EXPECT_NE(killed.status, 0) << killed.out;
  EXPECT_FALSE(std::filesystem::exists(other_));
  Outcome again = mirvae("init --demo " + quote(other_));
  EXPECT_EQ(again.status, 0) << again.out;
  EXPECT_EQ(mirvae("ledger " + quote(other_)).out, "Grand livre vide.\n");
  // What the killed one was building stays beside, under a name of its own.
  auto folder = std::filesystem::path(other_).parent_path();
  for (const auto& entry : std::filesystem::directory_iterator(folder))
    if (entry.path().string().rfind(other_ + ".", 0) == 0) std::filesystem::remove(entry.path());
}

TEST_F(MirvaeRunTest, ListingAndExportWriteTheLedgerAsStoredOrNameTheValueTheyCannotRead) {
  // One piece, its first label longer than the listing's column, with accents where
  // the column is cut.
  const std::string label = "Brasserie Lissandre : dîner d’équipe à Montréal";
  writeBehind(dossier_,
              "INSERT INTO PIECE (NPIES, NPIEC, NUMJL, DTOPE, LIBPI) VALUES "
              "('00000000001', 'VT0001', 'VT', '2024-03-15', 'Facture client n° VT0001');"
              "INSERT INTO MOUVE (UNIQ, NPIES, NLIGS, NUMCP, LIBEC, MTDEB, MTCRE) VALUES "
              "(1, '00000000001', '000000000010001', '411001', '" + label + "', '120', '0'), "
              "(2, '00000000001', '000000000010002', '706000', 'Ventes', '0', '120');");
  Outcome listing = mirvae("ledger " + quote(dossier_));
  ASSERT_EQ(listing.status, 0) << listing.out;
  std::string lines = listing.out;
  std::erase(lines, '\n');
  EXPECT_EQ(host::text::flaw(lines), std::nullopt) << listing.out;
  EXPECT_NE(listing.out.find(host::text::substring(label, 1, 34) + "  "), std::string::npos) << listing.out;
  EXPECT_NE(listing.out.find("Total des mouvements : débit 120.00 EUR, crédit 120.00 EUR"), std::string::npos);

  struct Case {
    const char* sql;
    const char* why;
    bool exported;  // the value is part of the hledger journal
  } cases[] = {
      {"UPDATE MOUVE SET MTDEB = 'abc' WHERE UNIQ = 1",
       "table MOUVE, ligne UNIQ = 1, colonne MTDEB : « abc » n'est pas un montant", true},
      {"UPDATE MOUVE SET LIBEC = 'Ventes' || char(13) || 'X' WHERE UNIQ = 2",
       "table MOUVE, ligne UNIQ = 2, colonne LIBEC : caractère de contrôle U+000D en position 7", false},
      {"UPDATE PIECE SET LIBPI = CAST(X'46616374C3' AS TEXT)",
       "table PIECE, ligne NPIES = 00000000001, colonne LIBPI : octet 0xC3 hors UTF-8 en position 5", true},
      {"UPDATE PIECE SET DTOPE = '15/03/2024'",
       "table PIECE, ligne NPIES = 00000000001, colonne DTOPE : « 15/03/2024 » n'est pas une date AAAA-MM-JJ", true},
  };
  other_ = testing_support::cheminTemporaire("mirvae-malformed");
  const std::string journal = other_ + ".journal";
  for (const Case& c : cases) {
    SCOPED_TRACE(c.sql);
    std::filesystem::copy_file(dossier_, other_, std::filesystem::copy_options::overwrite_existing);
    writeBehind(other_, c.sql);
    Outcome listed = mirvae("ledger " + quote(other_));
    EXPECT_EQ(listed.status, 1) << listed.out;
    EXPECT_EQ(listed.out, std::string("mirvae : valeur illisible dans le grand livre : ") + c.why + "\n");
    std::ofstream(journal) << "journal précédent\n";
    Outcome exported = mirvae("export " + quote(other_) + " -o " + quote(journal));
    EXPECT_EQ(exported.status, c.exported ? 1 : 0) << exported.out;
    EXPECT_EQ(exported.out.find(c.why) != std::string::npos, c.exported) << exported.out;
    // A failed export leaves the file it would have written as it was.
    if (c.exported) {
      EXPECT_EQ(contents(journal), "journal précédent\n");
    }
  }
  std::filesystem::remove(journal);
}

TEST_F(MirvaeRunTest, PrintWritesTheFormOrTheListAsAPdfFileAndNamesIt) {
  writeBehind(dossier_,
              "INSERT INTO MIRVAE (IDENT, TYPE, DTOPE, NUMCP, NPIEC, INPIE, MONNAIE_IDENT, HT, TVA, TTC) VALUES "
              "('00000901', 'FC', date('now'), '411001', 'VT901', 'Facture client n° VT901', 'EUR', '1234.56', "
              "'246.91', '1481.47');"
              "INSERT INTO MIRVAL (IDENT, NUMERO, NUMCP, TXTVA, HT, TVA, TTC) VALUES "
              "('00000902', '00000901|000001', '706300', 20, '1234.56', '246.91', '1481.47');"
              "INSERT INTO MIRVAE (IDENT, TYPE, DTOPE, NUMCP, NPIEC, INPIE, MONNAIE_IDENT, HT, TVA, TTC, TYPE_DR) "
              "VALUES ('00000903', 'BQ', '2024-03-05', '512100', 'BQ903', 'Frais de tenue', 'EUR', '12.5', '0', "
              "'12.5', 'D');");
  other_ = testing_support::cheminTemporaire("mirvae-print") + ".pdf";
  const std::string folder = std::filesystem::path(dossier_).replace_extension("").string() + "-impressions";
  const struct {
    std::string args;
    int status;
    std::string said;                // in what the program printed
    std::vector<std::string> text;   // in the PDF file, in order
  } cases[] = {
      {"fiche1 00000901 -o " + quote(other_), 0, "Impression : " + other_,
       {"Facture client", "VT901", "Brasserie Lissandre", "706300", "1 234,56", "20 %", "Total TTC", "1 481,47"}},
      {"liste1 --to 31/12/2099 -o " + quote(other_), 0, "Impression : " + other_,
       {"Factures clients", "Du", "...", "Au", "31/12/2099", "VT901", "1 481,47"}},
      {"liste4 --from 2024-03-01 --account 512100 --direction D -o " + quote(other_), 0, "Impression : ",
       {"Du", "01/03/2024", "31/12/9999", "512100", "Banque compte courant", "Sens", "D", "Dépense", "-12,50"}},
      {"fiche1 00000901", 0, "Impression : " + folder + "/fiche1-001.pdf", {}},
      {"fiche2 00000901", 1, "aucune opération « 00000901 » de ce type (FF)", {}},
      {"fiche1", 1, "donner son IDENT", {}},
      {"liste7", 1, "impression « liste7 » inconnue", {}},
      {"liste1 --direction D", 1, "seules les listes de banque et de caisse ont un sens", {}},
      {"liste1 --from 31/02/2024", 1, "--from", {}},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.args);
    std::filesystem::remove(other_);
    Outcome printed = mirvae("print " + quote(dossier_) + " " + c.args);
    EXPECT_EQ(printed.status, c.status) << printed.out;
    EXPECT_NE(printed.out.find(c.said), std::string::npos) << printed.out;
    if (c.text.empty()) continue;
    std::string text = run("pdftotext -layout " + quote(other_) + " -").out;
    std::size_t at = 0;
    for (const std::string& wanted : c.text) {
      std::size_t found = text.find(wanted, at);
      EXPECT_NE(found, std::string::npos) << wanted << " in\n" << text;
      if (found != std::string::npos) at = found + wanted.size();
    }
  }
  EXPECT_TRUE(std::filesystem::exists(folder + "/fiche1-001.pdf"));

  // From the screens, the print goes to the dossier's print folder and the transcript names it.
  Outcome session = play(
      "open MIRVAE-ACCES1\n"
      "select 1\n"
      "press IMPR_FICHE\n"
      "expect no error\n"
      "press IMPR_LISTE\n"
      "expect no error\n");
  EXPECT_EQ(session.status, 0) << session.out;
  EXPECT_NE(session.out.find("[impression] fiche1 : " + folder + "/fiche1-002.pdf"), std::string::npos) << session.out;
  EXPECT_NE(session.out.find("[impression] liste1 : " + folder + "/liste1-001.pdf"), std::string::npos) << session.out;
  EXPECT_TRUE(std::filesystem::exists(folder + "/liste1-001.pdf"));
  std::filesystem::remove_all(folder);
}

}  // namespace
