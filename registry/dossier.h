// Making and opening dossiers: one SQLite file each, holding the module's tables,
// the accounting base's reference and ledger tables, and the label tables.
#pragma once

#include <chrono>
#include <memory>
#include <string>
#include <string_view>

#include "host/database.h"

namespace registry {

// Creates a dossier at `path` with the whole dictionary and the label texts; with
// `demo`, also the demo company, whose exercise is the calendar year of `today`.
// Refuses (HostError) a path where a file already exists. The dossier is made beside
// `path` and appears there whole, or not at all, even when the process is killed.
void creerDossier(const std::string& path, bool demo, std::chrono::year_month_day today);
// The same, with `referenceSql` run after the dictionary in the transaction that makes
// the dossier: a dossier whose reference data fail to load is not made.
void creerDossier(const std::string& path, std::string_view referenceSql);

// Opens an existing dossier (HostError when missing, not a dossier, or of another
// schema version; the file is left untouched).
std::unique_ptr<host::Database> ouvrirDossier(const std::string& path);

}  // namespace registry
