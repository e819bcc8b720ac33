#include "registry/dossier.h"

#include <filesystem>

#include "host/error.h"
#include "host/value.h"

extern const char* const dictionary_sql;
extern const char* const labels_sql;
extern const char* const demo_sql;

namespace registry {

using namespace std::chrono;

namespace {

void replaceAll(std::string& text, const std::string& token, const std::string& value) {
  for (std::size_t at = text.find(token); at != std::string::npos; at = text.find(token, at + value.size()))
    text.replace(at, token.size(), value);
}

}  // namespace

void creerDossier(const std::string& path, bool demo, year_month_day today) {
  if (std::filesystem::exists(path)) throw host::HostError("le fichier « " + path + " » existe déjà");
  try {
    auto db = host::Database::creer(path);
    db->exec("BEGIN");
    db->exec(dictionary_sql);
    db->exec(labels_sql);
    if (demo) {
      // The demo's exercise is the calendar year that holds the day it is made.
      std::string sql = demo_sql;
      year_month_day first{today.year(), January, day(1)};
      year_month_day last{today.year(), December, day(31)};
      replaceAll(sql, "{{PDDEX}}", host::jourIso(first));
      replaceAll(sql, "{{PDFEX}}", host::jourIso(last));
      replaceAll(sql, "{{PDTCL}}", host::jourIso(last));
      db->exec(sql);
    }
    db->exec("COMMIT");
    db->exec("PRAGMA journal_mode = WAL");
  } catch (...) {
    std::error_code ignored;
    std::filesystem::remove(path, ignored);
    std::filesystem::remove(path + "-wal", ignored);
    std::filesystem::remove(path + "-shm", ignored);
    throw;
  }
}

std::unique_ptr<host::Database> ouvrirDossier(const std::string& path) { return host::Database::ouvrir(path); }

}  // namespace registry
