#include "tests/support/fixture.h"

#include <sys/wait.h>
#include <unistd.h>

#include <atomic>
#include <cstdio>

#include "app/script.h"

namespace testing_support {

std::string cheminTemporaire(const std::string& stem) {
  // Process numbers come round again: a name left by an earlier run is skipped, since
  // a dossier is never made over an existing file.
  static std::atomic<int> counter{0};
  for (;;) {
    std::string path = (std::filesystem::temp_directory_path() /
                        (stem + "-" + std::to_string(::getpid()) + "-" + std::to_string(counter++) + ".db"))
                           .string();
    if (!std::filesystem::exists(path) && !std::filesystem::exists(path + "-wal")) return path;
  }
}

CommandResult runCommand(const std::string& command_line) {
  std::string command = command_line + " 2>&1";
  FILE* pipe = ::popen(command.c_str(), "r");
  if (!pipe) return {-1, "popen"};
  std::string out;
  char buffer[4096];
  for (std::size_t n; (n = std::fread(buffer, 1, sizeof buffer, pipe)) > 0;) out.append(buffer, n);
  int status = ::pclose(pipe);
  return {WIFEXITED(status) ? WEXITSTATUS(status) : -1, out};
}

::testing::AssertionResult inOrder(const std::string& text, const std::vector<std::string>& wanted) {
  std::size_t at = 0;
  for (const std::string& w : wanted) {
    std::size_t found = text.find(w, at);
    if (found == std::string::npos)
      return ::testing::AssertionFailure() << "« " << w << " » missing or out of order in:\n" << text;
    at = found + w.size();
  }
  return ::testing::AssertionSuccess();
}

ModuleStandIn::ModuleStandIn(const std::string& name, host::Fabrique factory) : name_(name) {
  app::chargerModules();  // the library's own modules first, or they would come after the stand-in
  if (host::Registre::instance().module(name))
    kept_ = host::Registre::instance().substituer(name, factory);
  else
    host::Module("", name_.c_str(), factory, false, "");
}

ModuleStandIn::~ModuleStandIn() {
  if (kept_) host::Registre::instance().substituer(name_, kept_);
}

std::vector<std::string> incoherences(host::Database& db) {
  static const std::pair<const char*, const char*> checks[] = {
      {"opération sans sa pièce",
       "SELECT IDENT FROM MIRVAE e WHERE NPIES <> '' AND NOT EXISTS (SELECT 1 FROM PIECE p WHERE p.NPIES = e.NPIES)"},
      {"pièce sans son opération",
       "SELECT NPIES FROM PIECE p WHERE NOT EXISTS (SELECT 1 FROM MIRVAE e WHERE e.NPIES = p.NPIES)"},
      {"pièce de deux opérations", "SELECT NPIES FROM MIRVAE WHERE NPIES <> '' GROUP BY NPIES HAVING count(*) > 1"},
      {"en-tête différent de la somme de ses lignes",
       "SELECT IDENT FROM MIRVAE e WHERE abs(CAST(HT AS REAL) - (SELECT coalesce(sum(CAST(HT AS REAL)), 0) FROM "
       "MIRVAL l WHERE l.NUMERO GLOB e.IDENT || '|*')) > 0.0001 OR abs(CAST(TTC AS REAL) - (SELECT "
       "coalesce(sum(CAST(TTC AS REAL)), 0) FROM MIRVAL l WHERE l.NUMERO GLOB e.IDENT || '|*')) > 0.0001"},
      {"pièce déséquilibrée",
       "SELECT NPIES FROM MOUVE GROUP BY NPIES HAVING abs(sum(CAST(MTDEB AS REAL)) - sum(CAST(MTCRE AS REAL))) > "
       "0.0001"},
      {"ventilation analytique différente de son mouvement",
       "SELECT m.UNIQ FROM MOUVE m JOIN (SELECT MOUVE_UNIQ, sum(CAST(MTADE AS REAL)) d, sum(CAST(MTACR AS REAL)) c "
       "FROM VTSEC GROUP BY MOUVE_UNIQ) v ON v.MOUVE_UNIQ = m.UNIQ WHERE abs(v.d - CAST(m.MTDEBS AS REAL)) > 0.0001 "
       "OR abs(v.c - CAST(m.MTCRES AS REAL)) > 0.0001"},
      {"mouvement sans pièce", "SELECT UNIQ FROM MOUVE m WHERE NOT EXISTS (SELECT 1 FROM PIECE p WHERE p.NPIES = m.NPIES)"},
      {"instance d'import ouverte", "SELECT NINST FROM IMPORT_INSTANCE WHERE ETAT = 'O'"},
      {"ligne de transfert laissée",
       "SELECT NINST FROM PIECE_IMM UNION ALL SELECT NINST FROM MOUVE_IMM UNION ALL SELECT NINST FROM ECHEA_IMM "
       "UNION ALL SELECT NINST FROM VTSEC_IMM"},
  };
  std::vector<std::string> found;
  for (const auto& [what, query] : checks) {
    host::Statement& s = db.prepare(query);
    while (s.step()) found.push_back(std::string(what) + " : " + s.text(0));
    s.reset();
  }
  return found;
}

void DossierTest::SetUp() {
  app::chargerModules();
  host::clock::setToday(jourDeTest());
  host::clock::setTimeOfDay("10:30:00");
  path_ = cheminTemporaire("mirvae-test");
  registry::creerDossier(path_, demo_, jourDeTest());
  session_ = std::make_unique<host::Session>(registry::ouvrirDossier(path_), user_, "testeur");
}

void DossierTest::TearDown() {
  session_.reset();
  host::clock::setToday(std::nullopt);
  host::clock::setTimeOfDay(std::nullopt);
  for (const char* suffix : {"", "-wal", "-shm"}) std::filesystem::remove(path_ + suffix);
}

void DossierTest::rouvrir() {
  session_.reset();
  session_ = std::make_unique<host::Session>(registry::ouvrirDossier(path_), user_, "testeur");
}

std::string DossierTest::sql(const std::string& query) {
  host::Statement& s = base().prepare(query);
  std::string value = s.step() ? s.text(0) : std::string();
  s.reset();
  return value;
}

}  // namespace testing_support
