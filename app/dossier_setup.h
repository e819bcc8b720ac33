// Setting up a real company's dossier without SQL: its making with the standard
// French reference data, the options a person changes, and its chart, tiers and
// currency rates brought in from CSV files.
#pragma once

#include <chrono>
#include <ostream>
#include <string>

#include "host/database.h"

namespace app {

struct Company {
  std::string name;
  // First day of the first exercise, which lasts twelve months.
  std::chrono::year_month_day exerciseStart;
  std::string currency = "EUR";
};

// Makes the dossier at `path` with the company's reference data (chart of accounts,
// VAT codes and rates, journals, dossier parameters), ready for entry. HostError for
// a name or currency that cannot be kept, or a path that exists.
void creerSociete(const std::string& path, const Company& company);

// Sets one option of the dossier (a company fact or a dossier parameter, by the name
// `afficherOptions` lists). HostError naming the option and why for an unknown option
// or a value out of range; nothing is written then.
void definirOption(host::Database& db, const std::string& option, const std::string& value);

// Every option with its value and what it means, one a line.
void afficherOptions(host::Database& db, std::ostream& out);

enum class ImportKind { accounts, tiers, rates };

struct ImportReport {
  int written = 0;
  std::vector<std::string> refused;  // "ligne N : why", in file order
};

// Reads a CSV file (UTF-8, or CP1252 when it is not valid UTF-8; ';' or ',' as its
// header line shows) and writes its rows in one transaction. Without `skipBad`, a
// single refused row leaves the dossier untouched (written stays 0). HostError for a
// file that cannot be read at all (missing, no header, a required column absent).
ImportReport importer(host::Database& db, ImportKind kind, const std::string& file, bool skipBad);

}  // namespace app
