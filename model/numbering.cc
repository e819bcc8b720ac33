#include "model/numbering.h"

#include "host/error.h"

namespace model {

std::string prochainIdentifiant(host::Database& db, const std::string& table, int width) {
  host::Statement& make = db.prepare("INSERT OR IGNORE INTO \"NDOC\" (\"NOM\", \"DERNIER\") VALUES (?, 0)");
  make.bind(1, table);
  make.step();
  make.reset();
  host::Statement& bump = db.prepare("UPDATE \"NDOC\" SET \"DERNIER\" = \"DERNIER\" + 1 WHERE \"NOM\" = ?");
  bump.bind(1, table);
  bump.step();
  bump.reset();
  host::Statement& read = db.prepare("SELECT \"DERNIER\" FROM \"NDOC\" WHERE \"NOM\" = ?");
  read.bind(1, table);
  read.step();
  long long last = read.integer(0);
  read.reset();
  std::string number = std::to_string(last);
  if (static_cast<int>(number.size()) > width)
    throw host::HostError("le compteur « " + table + " » a dépassé " + std::to_string(width) + " chiffres");
  return std::string(width - number.size(), '0') + number;
}

}  // namespace model
