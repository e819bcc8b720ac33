// The file of accounting entries a French company hands to the tax office: every
// movement of one exercise, one line each, in the 18 columns the law fixes.
#pragma once

#include <optional>
#include <string>

#include "host/database.h"

namespace app {

struct FecRequest {
  // The exercise that ends in this year; the dossier's current one when absent.
  std::optional<int> year;
  char separator = '\t';  // '\t' or '|'
};

struct FecFile {
  // SIRENFECYYYYMMDD.txt (the exercise's last day) when the dossier holds its SIREN,
  // "" otherwise.
  std::string name;
  std::string content;  // ISO 8859-15 text, a header line then one line a movement
  int lines = 0;        // movements written
};

// Builds the file and checks it as the tax office would before handing it back:
// every piece balances, every required field is filled, every entry date is inside
// the exercise, no field holds the separator or a character the encoding lacks.
// HostError naming the first fault otherwise; nothing is to be written then.
//
// Each ledger account is written as CompteNum with its title; CompAuxNum and
// CompAuxLib stay empty, since the chart holds clients, suppliers and staff as
// accounts of their own rather than beneath a collective account. Pieces come in
// the order the ledger validated them (its piece number), numbered 1, 2, 3... in
// EcritureNum; ValidDate is the day the ledger took the piece.
FecFile exporterFec(host::Database& db, const FecRequest& request);

}  // namespace app
