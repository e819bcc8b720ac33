#include "host/counter.h"

#include "host/database.h"
#include "host/error.h"

namespace host {

namespace {

// The query of the largest number in `used`, 0 when there is none. Among texts of one
// width made of digits, text order is number order, so the column's index gives the
// largest at once instead of the whole table being read at each draw.
std::string largestUsed(const UsedNumbers& used) {
  std::string column = quoteIdent(used.column), table = quoteIdent(used.table);
  if (used.width == 0) return "SELECT coalesce(max(" + column + "), 0) FROM " + table;
  return "SELECT coalesce((SELECT CAST(" + column + " AS INTEGER) FROM " + table + " WHERE " + column + " BETWEEN " +
         quoteText(std::string(used.width, '0')) + " AND " + quoteText(std::string(used.width, '9')) +
         " AND length(" + column + ") = " + std::to_string(used.width) + " AND " + column +
         " NOT GLOB '*[^0-9]*' ORDER BY " + column + " DESC LIMIT 1), 0)";
}

}  // namespace

long long nextNumber(Database& db, const std::string& name, const std::optional<UsedNumbers>& used) {
  // Outside a unit the draw would be kept even when the action that wanted it fails.
  if (db.profondeur() == 0) throw HostError("le compteur « " + name + " » est tiré hors d'une unité de travail");
  Statement& make = db.prepare("INSERT OR IGNORE INTO \"NDOC\" (\"NOM\", \"DERNIER\") VALUES (?, 0)");
  make.bind(1, name);
  make.step();
  make.reset();
  std::string floor = used ? "max(\"DERNIER\", (" + largestUsed(*used) + "))" : std::string("\"DERNIER\"");
  Statement& next =
      db.prepare("UPDATE \"NDOC\" SET \"DERNIER\" = " + floor + " + 1 WHERE \"NOM\" = ? RETURNING \"DERNIER\"");
  next.bind(1, name);
  next.step();
  long long number = next.integer(0);
  next.reset();
  return number;
}

std::string nextNumberText(Database& db, const std::string& name, int width, const std::optional<UsedNumbers>& used) {
  std::string digits = std::to_string(nextNumber(db, name, used));
  if (static_cast<int>(digits.size()) > width)
    throw HostError("le compteur « " + name + " » a dépassé " + std::to_string(width) + " chiffres");
  return std::string(width - digits.size(), '0') + digits;
}

std::string nextIdentifier(Database& db, const std::string& table, int width) {
  std::optional<UsedNumbers> used;
  if (db.existe(table))
    for (const Colonne& c : db.colonnes(table))
      if (c.name == "IDENT") used = UsedNumbers{.table = table, .column = "IDENT", .width = width};
  return nextNumberText(db, table, width, used);
}

}  // namespace host
