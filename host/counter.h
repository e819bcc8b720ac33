// The document counters of a dossier (table NDOC, one row NOM -> DERNIER per counter):
// identifiers of the module's rows, and the ledger's piece, movement and due-date numbers.
//
// Every number is drawn here, so that each counter keeps the same promise whoever
// draws from it: a number is never handed out twice, never falls below the largest
// number already kept where the counter's numbers go (a dossier restored or mended by
// hand does not hand out a number it already holds), and is drawn inside the caller's
// unit of work, so that an undone action gives it back and two processes never receive
// the same one.
#pragma once

#include <optional>
#include <string>

namespace host {

class Database;

// Where the numbers of a counter are kept once used: a column of a table, holding them
// as integers (width 0) or as texts of exactly `width` digits (a longer text, or one
// with a letter, is not one of them). The column should be the first of an index: its
// largest number is read at each draw.
struct UsedNumbers {
  std::string table;
  std::string column;
  int width = 0;
};

// The next number of counter `name` (made at 0 on first use): one more than both the
// counter and the largest number in `used`. HostError when the caller is not inside a
// unit of work.
long long nextNumber(Database& db, const std::string& name, const std::optional<UsedNumbers>& used);

// nextNumber as a text of `width` digits, zero-padded. HostError when the number no
// longer fits in `width` digits; the caller's unit, undone, then gives the draw back.
std::string nextNumberText(Database& db, const std::string& name, int width, const std::optional<UsedNumbers>& used);

// The identifier of a new row of `table`: `width` digits from the counter named after
// the table, above every identifier of that width in the table's IDENT column. A
// counter that names no table of the dossier only has its own numbers to keep above.
std::string nextIdentifier(Database& db, const std::string& table, int width);

}  // namespace host
