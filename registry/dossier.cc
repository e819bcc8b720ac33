#include "registry/dossier.h"

#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstdlib>
#include <filesystem>

#include "host/error.h"
#include "host/text.h"
#include "host/value.h"

extern const char* const dictionary_sql;
extern const char* const labels_sql;
extern const char* const demo_sql;

namespace registry {

using namespace std::chrono;

namespace {

// A file a dossier is made in before it takes its name; removed with its SQLite
// companions when the making ends, whichever way.
class BuildingFile {
 public:
  explicit BuildingFile(const std::string& target) : path_(target + ".XXXXXX") {
    int fd = ::mkstemp(path_.data());
    if (fd < 0)
      throw host::HostError("le dossier « " + target + " » ne peut être créé : " + host::systemReason(errno));
    // Made private by mkstemp; a dossier is opened by every user the umask lets in.
    mode_t mask = ::umask(0);
    ::umask(mask);
    ::fchmod(fd, 0666 & ~mask);
    ::close(fd);
  }
  ~BuildingFile() {
    std::error_code ignored;
    for (const char* suffix : {"", "-journal", "-wal", "-shm"}) std::filesystem::remove(path_ + suffix, ignored);
  }
  BuildingFile(const BuildingFile&) = delete;
  BuildingFile& operator=(const BuildingFile&) = delete;
  const std::string& path() const { return path_; }

 private:
  std::string path_;
};

}  // namespace

void creerDossier(const std::string& path, bool demo, year_month_day today) {
  if (!demo) return creerDossier(path, std::string_view());
  // The demo's exercise is the calendar year that holds the day it is made.
  std::string sql = demo_sql;
  year_month_day first{today.year(), January, day(1)};
  year_month_day last{today.year(), December, day(31)};
  host::text::replaceAll(sql, "{{PDDEX}}", host::jourIso(first));
  host::text::replaceAll(sql, "{{PDFEX}}", host::jourIso(last));
  host::text::replaceAll(sql, "{{PDTCL}}", host::jourIso(last));
  creerDossier(path, sql);
}

void creerDossier(const std::string& path, std::string_view referenceSql) {
  if (std::filesystem::exists(path)) throw host::HostError("le fichier « " + path + " » existe déjà");
  // The dossier is made in a file of its own beside the target and takes the target's
  // name only once whole: a process killed half-way leaves nothing under that name,
  // and the next creation there is not in its way.
  BuildingFile building(path);
  try {
    auto db = host::Database::creer(building.path());
    db->exec("BEGIN");
    db->exec(dictionary_sql);
    db->exec(labels_sql);
    if (!referenceSql.empty()) db->exec(referenceSql);
    db->exec("COMMIT");
    db->exec("PRAGMA journal_mode = WAL");
  } catch (const host::HostError& error) {
    throw host::HostError("le dossier « " + path + " » ne peut être créé : " + error.what());
  }
  // A link, unlike a rename, never replaces a file that appeared at `path` meanwhile.
  if (::link(building.path().c_str(), path.c_str()) != 0) {
    if (errno == EEXIST) throw host::HostError("le fichier « " + path + " » existe déjà");
    throw host::HostError("le dossier « " + path + " » ne peut être créé : " + host::systemReason(errno));
  }
}

// What each schema version added to the one before, for the dossiers made by an
// earlier program.
const std::vector<host::Database::MiseANiveau> kUpgrades = {
    {"1", "2",
     // Settlement: the lettering day of a movement and the lettering group of a due
     // date; browsers limited to one account or one piece number read it through an
     // index.
     R"(ALTER TABLE "MOUVE" ADD COLUMN "DTLET" DATE TEXT NOT NULL DEFAULT '';
        ALTER TABLE "ECHEA" ADD COLUMN "RELET" TEXT NOT NULL DEFAULT '';
        CREATE INDEX IF NOT EXISTS "MIRVAE_COMPTE" ON "MIRVAE" ("TYPE", "NUMCP", "DTOPE", "NPIEC", "IDENT");
        CREATE INDEX IF NOT EXISTS "MIRVAE_PIECE" ON "MIRVAE" ("TYPE", "NPIEC", "DTOPE", "IDENT");)"},
};

std::unique_ptr<host::Database> ouvrirDossier(const std::string& path) {
  return host::Database::ouvrir(path, kUpgrades);
}

}  // namespace registry
