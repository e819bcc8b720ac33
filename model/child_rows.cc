#include "model/child_rows.h"

namespace model {

namespace {

// Selects the rows of `line` in `table`.
void selectRows(host::Table& table, const LineKey& key, const std::string& line) {
  table.initRequete();
  if (key.form == LineKey::IdentAndBar)
    table.ajouteFiltre(key.field, '/', line + "|");
  else
    table.ajouteFiltre(key.field, '=', line);
}

}  // namespace

void copyChildRows(host::Table& from, LineKey fromNumero, host::Table& to, const std::string& line,
                   const std::function<void()>& adjust) {
  selectRows(from, fromNumero, line);
  from.activeRequete();
  for (int rc = from.suivant(3); rc == 0; rc = from.suivant(1)) {
    to.raz();
    to.copier(from);
    if (adjust) adjust();
    to.ecrit();
  }
  from.initRequete();
  to.initRequete();
}

void convertChildRows(host::Table& table, LineKey numero, const std::string& line,
                      std::initializer_list<host::Champ*> amounts,
                      const std::function<host::Decimal(const host::Decimal&)>& convert) {
  selectRows(table, numero, line);
  table.activeRequete();
  for (int rc = table.suivant(3); rc == 0; rc = table.suivant(1)) {
    for (host::Champ* amount : amounts) *amount = convert(amount->decimal());
    table.ecrit();
  }
  table.initRequete();
}

void removeChildRows(host::Table& table, LineKey numero, const std::string& line) {
  selectRows(table, numero, line);
  table.vide();
  table.initRequete();
}

}  // namespace model
