// The `mirvae` program itself, run as a person runs it: session scripts through
// `mirvae run` on a fresh demo dossier, the demo, a company's dossier set up without
// SQL and its entries handed over as a FEC, and --help on every command.
#include <gtest/gtest.h>
#include <sqlite3.h>
#include <signal.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cstdio>
#include <filesystem>
#include <fstream>
#include <sstream>

#include "app/fec_export.h"
#include "app/script.h"
#include "host/database.h"
#include "host/decimal.h"
#include "host/text.h"
#include "tests/support/fixture.h"

namespace {

using Outcome = testing_support::CommandResult;

Outcome run(const std::string& command_line) { return testing_support::runCommand(command_line); }

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
  std::ifstream in(path, std::ios::binary);
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
  // Plays a session script on the demo dossier, or on `dossier`.
  Outcome play(const std::string& text, const std::string& dossier = "") {
    std::ofstream(script_) << text;
    return mirvae("run " + quote(dossier.empty() ? dossier_ : dossier) + " " + quote(script_));
  }

  std::string dossier_, script_, other_;
};

// A script that fails, cannot be understood or cannot be found ends the program with a
// failure that names the script's line.
TEST_F(MirvaeRunTest, AScriptThatFailsOrIsMissingExitsNonZeroNamingItsLine) {
  const struct {
    std::string dossier, script, text;
    int status;  // -1: any failure
    std::string said, why;
  } cases[] = {
      {dossier_, script_,
       "today 15/03/2024\n\nexpect sql \"SELECT count(*) FROM COMPT WHERE NUMCP LIKE '512%'\" = 3\n"
       "expect sql \"SELECT 1\" = 1\n",
       1, script_ + ":3: expect sql", "la requête donne « 2 », attendu « 3 »"},
      {dossier_, script_, "today 15/03/2024\nappuyer VALIDER\n", 1,
       script_ + ":2: appuyer VALIDER : instruction inconnue", ""},
      {dossier_, "/nonexistent/script.txt", "", -1, "", ""},
      {"/nonexistent/dossier.db", script_, "today 15/03/2024\n", -1, "", ""},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.dossier + " " + c.script + " " + c.text);
    std::ofstream(script_) << c.text;
    Outcome run = mirvae("run " + quote(c.dossier) + " " + quote(c.script));
    if (c.status < 0) {
      EXPECT_NE(run.status, 0) << run.out;
    } else {
      EXPECT_EQ(run.status, c.status) << run.out;
    }
    EXPECT_NE(run.out.find(c.said), std::string::npos) << run.out;
    EXPECT_NE(run.out.find(c.why), std::string::npos) << run.out;
  }
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
  // The ledger tells each due date's state: the client's invoice and credit note
  // settled by the bank receipt, the supplier's invoice still open.
  Outcome listed = mirvae("ledger " + quote(other_));
  EXPECT_NE(listed.out.find(": 1794.00, réglée (1794.00) par la pièce "), std::string::npos) << listed.out;
  EXPECT_NE(listed.out.find(": 3060.00, ouverte"), std::string::npos) << listed.out;
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
    // The bank account holds the client's receipt, 1464.00, and the dollar receipt
    // valued at its own day's rate, 952.38.
    Outcome bank = run("hledger -f " + quote(journal) + " balance 512100 --no-total");
    EXPECT_NE(bank.out.find("2416.38 EUR  512100"), std::string::npos) << bank.out;
    // Every settled client is left with nothing open in euros, exchange difference booked.
    for (const char* client : {"411001", "411006"}) {
      Outcome settled = run("hledger -f " + quote(journal) + " balance " + client + " --no-total");
      EXPECT_EQ(settled.out.find(client), std::string::npos) << settled.out;
    }
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

// The program killed at any moment of a session that saves invoices one after the
// other: every invoice whose save the user saw confirmed is in the books with its
// piece, and nothing is half-written.
TEST_F(MirvaeRunTest, AKilledSessionKeepsEverySaveItConfirmedAndNothingHalfWritten) {
  std::string text = "open MIRVAE-ACCES1\n";
  const int invoices = 4;
  for (int i = 1; i <= invoices; ++i)
    text += "press CREER\ntype VLIBCP1 \"Brasserie Lissandre\"\nline new\ntype LST_MIRVAL.NUMCP 706300\n"
            "type LST_V_HT " + std::to_string(100 * i) + "\nline validate\nline new\ntype LST_MIRVAL.NUMCP 708500\n"
            "type LST_V_HT 10\nline validate\nanswer dialog 1\npress B_VALID_DOC\nexpect no error\nsay SAVED\nclose\n";
  std::ofstream(script_) << text;
  for (int killAfter : {3, 11, 16, 24, 33, 47}) {
    SCOPED_TRACE(killAfter);
    std::filesystem::remove(dossier_);
    for (const char* suffix : {"-wal", "-shm"}) std::filesystem::remove(dossier_ + suffix);
    ASSERT_EQ(mirvae("init --demo " + quote(dossier_)).status, 0);
    int out[2];
    ASSERT_EQ(::pipe(out), 0);
    pid_t child = ::fork();
    if (child == 0) {
      ::dup2(out[1], 1);
      ::close(out[0]);
      ::execl(MIRVAE_BINARY, MIRVAE_BINARY, "run", dossier_.c_str(), script_.c_str(), static_cast<char*>(nullptr));
      ::_exit(127);
    }
    ::close(out[1]);
    // Reads the transcript line by line and kills the program right after line
    // `killAfter` arrived.
    int lines = 0, confirmed = 0;
    std::string pending;
    char c;
    while (lines < killAfter && ::read(out[0], &c, 1) == 1) {
      if (c != '\n') {
        pending += c;
        continue;
      }
      ++lines;
      if (pending == "SAVED") ++confirmed;
      pending.clear();
    }
    ::kill(child, SIGKILL);
    ::waitpid(child, nullptr, 0);
    ::close(out[0]);
    auto db = host::Database::ouvrir(dossier_);
    EXPECT_TRUE(testing_support::incoherences(*db).empty());
    host::Statement& saved = db->prepare("SELECT count(*) FROM MIRVAE WHERE NPIES <> ''");
    ASSERT_TRUE(saved.step());
    EXPECT_GE(saved.integer(0), confirmed);
    saved.reset();
  }
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

// A client invoice, a supplier invoice and a bank receipt, on the generic tiers a new
// company's chart holds before its own are imported.
const char* const kFirstOperations = R"(today 15/03/2024 10:30
open MIRVAE-ACCES1
press CREER
type VLIBCP1 Clients
expect value MIRVAE.NUMCP 411000
line new
type LST_MIRVAL.NUMCP 707000
type LST_V_HT 1000
line validate
line new
type LST_MIRVAL.NUMCP 706000
type LST_V_HT 500
line validate
expect value V_TOT_TTC 1800.00
answer dialog 1
press B_VALID_DOC
expect no error
close
close
open MIRVAE-ACCES2
press CREER
type VLIBCP1 Fournisseurs
line new
type LST_MIRVAL.NUMCP 601000
type LST_V_HT 400
line validate
line new
type LST_MIRVAL.NUMCP 625100
type LST_V_HT 100
line validate
expect value V_TOT_TTC 590.00
answer dialog 1
press B_VALID_DOC
expect no error
close
close
open MIRVAE-ACCES4
expect value VNUMCP1 512000
press CREER
line new
type LST_MIRVAL.NUMCP 411000
type LST_V_HT 1800
line validate
expect screen MIRVAE-GEST_JUS
expect rows 1
press VALID
press VALID
expect screen MIRVAE-GESTION4
answer dialog 1
press B_VALID_DOC
expect no error
expect sql "SELECT count(*) FROM PIECE" = 3
)";

std::vector<std::vector<std::string>> fecLines(const std::string& text, char separator) {
  std::vector<std::vector<std::string>> lines;
  std::istringstream in(text);
  for (std::string line; std::getline(in, line);) {
    std::vector<std::string> fields(1);
    for (char c : line) {
      if (c == separator)
        fields.emplace_back();
      else
        fields.back().push_back(c);
    }
    lines.push_back(fields);
  }
  return lines;
}

host::Decimal fecAmount(std::string text) {
  std::replace(text.begin(), text.end(), ',', '.');
  return host::Decimal::parse(text).value_or(host::Decimal(-1));
}

TEST_F(MirvaeRunTest, ACompanyDossierTakesItsFirstOperationsAndHandsThemOverAsAFec) {
  other_ = testing_support::cheminTemporaire("mirvae-company");
  Outcome init = mirvae("init " + quote(other_) + " --company \"Menuiserie Dupré SAS\" --exercise-start 01/01/2024");
  ASSERT_EQ(init.status, 0) << init.out;
  Outcome entered = play(kFirstOperations, other_);
  ASSERT_EQ(entered.status, 0) << entered.out;
  ASSERT_EQ(mirvae("set " + quote(other_) + " company_siren \"732 829 320\"").status, 0);

  auto folder = std::filesystem::path(other_).parent_path() / ("fec-" + std::filesystem::path(other_).stem().string());
  std::filesystem::create_directory(folder);
  for (char separator : {'\t', '|'}) {
    SCOPED_TRACE(separator);
    Outcome exported = mirvae("export " + quote(other_) + " --format fec -o " + quote(folder.string()) +
                              (separator == '|' ? " --separator '|'" : ""));
    ASSERT_EQ(exported.status, 0) << exported.out;
    auto lines = fecLines(contents((folder / "732829320FEC20241231.txt").string()), separator);
    ASSERT_EQ(lines.size(), 13u);
    EXPECT_EQ(lines[0][0], "JournalCode");
    EXPECT_EQ(lines[0][17], "Idevise");
    std::map<std::string, host::Decimal> balance;
    host::Decimal debit, credit;
    int piece = 0;
    for (std::size_t i = 1; i < lines.size(); ++i) {
      const auto& f = lines[i];
      ASSERT_EQ(f.size(), 18u) << i;
      // Pieces numbered on one sequence, each dated inside the exercise.
      int number = std::stoi(f[2]);
      EXPECT_TRUE(number == piece || number == piece + 1) << i;
      piece = number;
      EXPECT_EQ(f[3], "20240315");
      balance[f[2]] += fecAmount(f[11]) - fecAmount(f[12]);
      debit += fecAmount(f[11]);
      credit += fecAmount(f[12]);
    }
    EXPECT_EQ(piece, 3);
    for (const auto& [number, rest] : balance) EXPECT_TRUE(rest.isZero()) << "écriture " << number;
    // The same totals as the ledger's.
    EXPECT_EQ(debit.toString(2) + "/" + credit.toString(2), "4190.00/4190.00");
    EXPECT_NE(mirvae("ledger " + quote(other_)).out.find("débit 4190.00 EUR, crédit 4190.00 EUR"), std::string::npos);
  }

  // A file that would not pass is not written: a piece out of balance, a label
  // holding the separator.
  struct Case {
    const char* sql;
    const char* separator;
    const char* why;
  } cases[] = {
      {"UPDATE MOUVE SET MTDEB = '1800.01' WHERE NUMCP = '512000'", "tab", "l'écriture 3 n'est pas équilibrée"},
      {"UPDATE MOUVE SET LIBEC = 'Remise | chèques' WHERE NUMCP = '512000'", "'|'", "contient le séparateur"},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.sql);
    std::filesystem::remove_all(folder);
    std::filesystem::create_directory(folder);
    std::string copy = other_ + ".copy";
    std::filesystem::copy_file(other_, copy, std::filesystem::copy_options::overwrite_existing);
    writeBehind(copy, c.sql);
    Outcome refused = mirvae("export " + quote(copy) + " --format fec --separator " + c.separator + " -o " +
                             quote(folder.string()));
    EXPECT_EQ(refused.status, 1);
    EXPECT_NE(refused.out.find(c.why), std::string::npos) << refused.out;
    EXPECT_TRUE(std::filesystem::is_empty(folder));
    std::filesystem::remove(copy);
  }
  std::filesystem::remove_all(folder);
}

TEST_F(MirvaeRunTest, AnOptionOutOfRangeIsRefusedAndLeavesTheDossierAsItWas) {
  other_ = testing_support::cheminTemporaire("mirvae-options");
  ASSERT_EQ(mirvae("init " + quote(other_) + " --company Essai --exercise-start 01/07/2024").status, 0);
  struct Case {
    const char* option;
    const char* value;
    const char* why;  // "" when accepted
  } cases[] = {
      {"company_siren", "732829321", "sa clé de contrôle est fausse"},
      {"company_siren", "73282932", "un SIREN a 9 chiffres"},
      {"company_siren", "732829320", ""},
      {"company_postcode", "2400", "5 chiffres"},
      {"PDDEX", "01/07/2025", "avant son début"},
      {"PDFEX", "31/12/2026", "au plus 24 mois"},
      {"PDFEX", "31/02/2025", "n'est pas une date"},
      {"PDTCL", "30/06/2024", "la date de clôture doit tomber"},
      {"PMTVA", "X", "valeurs permises : D, E, vide"},
      {"PMTVA", "E", ""},
      {"PCECC", "999999", "compte inconnu"},
      {"OPT_ANA", "2", "valeurs permises : 1 (oui), 0 (non)"},
      {"CAPITAL", "1000", "option inconnue « CAPITAL »"},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(std::string(c.option) + " " + c.value);
    std::string before = mirvae("show " + quote(other_)).out;
    Outcome set = mirvae("set " + quote(other_) + " " + c.option + " " + quote(c.value));
    EXPECT_EQ(set.status, *c.why ? 1 : 0) << set.out;
    EXPECT_NE(set.out.find(c.why), std::string::npos) << set.out;
    if (*c.why) {
      EXPECT_EQ(mirvae("show " + quote(other_)).out, before);
    }
  }
  std::istringstream shown(mirvae("show " + quote(other_)).out);
  std::map<std::string, std::string> values;
  for (std::string line; std::getline(shown, line);) {
    std::istringstream words(line);
    std::string option, value;
    words >> option >> value;
    values[option] = value;
  }
  EXPECT_EQ(values["company_siren"], "732829320");
  EXPECT_EQ(values["PDDEX"], "2024-07-01");
  EXPECT_EQ(values["PDFEX"], "2025-06-30");
  EXPECT_EQ(values["PMTVA"], "E");
}

TEST_F(MirvaeRunTest, AnImportWritesItsWholeFileOrNothingAndKeepsAccentsOfEitherEncoding) {
  other_ = testing_support::cheminTemporaire("mirvae-import");
  ASSERT_EQ(mirvae("init " + quote(other_) + " --company Essai").status, 0);
  std::string file = other_ + ".csv";
  struct Case {
    const char* kind;
    std::string bytes;
    const char* flags;
    int status;
    const char* reported;  // on the output, "" for nothing
    const char* check;     // a query whose answer must be 0 afterwards
  } cases[] = {
      // One bad row in three: nothing written, the row named.
      {"accounts", "compte;libelle;nature;tva\n606110;Gaz;HU;A20\n606120;Fioul;HU;A99\n606130;Bois de chauffage;HU;A20\n",
       "", 1, "ligne 3 : code de TVA inconnu « A99 »", "SELECT count(*) FROM COMPT WHERE NUMCP IN ('606110', '606120', '606130')"},
      // The same with --skip-bad: the sound rows are written.
      {"accounts", "compte;libelle;nature;tva\n606110;Gaz;HU;A20\n606120;Fioul;HU;A99\n606130;Bois de chauffage;HU;A20\n",
       "--skip-bad", 0, "ligne 3", "SELECT count(*) - 2 FROM COMPT WHERE NUMCP IN ('606110', '606120', '606130')"},
      // Windows-1252 and commas, as a French spreadsheet saves them; a quoted field.
      {"tiers", "compte,nom,ville\n411100,Caf\xE9 des Ar\xE8nes,P\xC9RIGUEUX\n401100,\"\x8Cuvres, b\xE2timent\",BERGERAC\n",
       "", 0, "", "SELECT count(*) - 2 FROM COMPT WHERE LIBCP IN ('Café des Arènes', 'Œuvres, bâtiment') AND "
                  "VILCP IN ('PÉRIGUEUX', 'BERGERAC') AND NATUC IN ('C', 'F')"},
      // UTF-8 stays as it is.
      {"tiers", "compte;nom;nature\n421100;Émilie Roques;A\n", "", 0, "",
       "SELECT count(*) - 1 FROM COMPT WHERE LIBCP = 'Émilie Roques'"},
      {"tiers", "compte;nom\n512100;Banque bis\n", "", 1, "ligne 2 : le compte 512100 n'est ni client", "SELECT 0"},
      {"rates", "devise;date;cours\nUSD;01/01/2024;1,1050\nUSD;31/02/2024;1,2\n", "", 1,
       "ligne 3 : « 31/02/2024 » n'est pas une date", "SELECT count(*) FROM MONNAIE_COURS"},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.bytes);
    std::ofstream(file, std::ios::binary) << c.bytes;
    Outcome imported = mirvae("import " + quote(other_) + " " + c.kind + " " + quote(file) + " " + c.flags);
    EXPECT_EQ(imported.status, c.status) << imported.out;
    EXPECT_NE(imported.out.find(c.reported), std::string::npos) << imported.out;
    Outcome checked = play(std::string("expect sql \"") + c.check + "\" = 0\n", other_);
    EXPECT_EQ(checked.status, 0) << checked.out;
  }
  std::filesystem::remove(file);
}

// The demo's entries as the tax office would receive them, kept beside this file and
// read by a person: a change in the export shows here first. Today is fixed, so the
// exercise and the validation dates are those of the sample.
TEST(DemoFec, TheDemoExportsTheReviewedSample) {
  host::clock::setToday(testing_support::jourDeTest());
  host::clock::setTimeOfDay("10:30:00");
  std::string path = testing_support::cheminTemporaire("mirvae-demo-fec");
  std::ostringstream transcript;
  ASSERT_EQ(app::demo(path, transcript), 0) << transcript.str();
  app::FecFile file = app::exporterFec(*registry::ouvrirDossier(path), {});
  host::clock::setToday(std::nullopt);
  host::clock::setTimeOfDay(std::nullopt);
  for (const char* suffix : {"", "-wal", "-shm"}) std::filesystem::remove(path + suffix);
  auto sample = std::filesystem::path(MIRVAE_SOURCE_DIR) / "tests/e2e/demo_fec.txt";
  if (std::getenv("MIRVAE_WRITE_SAMPLES")) std::ofstream(sample, std::ios::binary) << file.content;
  EXPECT_EQ(file.content, contents(sample.string()));
  EXPECT_EQ(file.name, "");
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
    EXPECT_TRUE(testing_support::inOrder(run("pdftotext -layout " + quote(other_) + " -").out, c.text));
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
