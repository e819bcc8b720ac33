// Small helpers for the services that speak SQL to the dossier: values are always
// bound, in order, never pasted into the text.
#pragma once

#include <optional>
#include <string>

#include "host/database.h"

namespace services {

// The cached statement for `sql`, with `args` bound to ?1, ?2, ... The caller steps
// it and resets it.
template <typename... Args>
host::Statement& bound(host::Database& db, const std::string& sql, const Args&... args) {
  host::Statement& s = db.prepare(sql);
  int index = 1;
  (s.bind(index++, args), ...);
  return s;
}

// Runs a statement that returns no row.
template <typename... Args>
void execute(host::Database& db, const std::string& sql, const Args&... args) {
  host::Statement& s = bound(db, sql, args...);
  s.step();
  s.reset();
}

// The first column of the first row, or nothing when there is no row.
template <typename... Args>
std::optional<std::string> scalar(host::Database& db, const std::string& sql, const Args&... args) {
  host::Statement& s = bound(db, sql, args...);
  std::optional<std::string> value;
  if (s.step()) value = s.text(0);
  s.reset();
  return value;
}

}  // namespace services
