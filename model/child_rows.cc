#include "model/child_rows.h"

namespace model {

namespace {

std::string prefix(const std::string& line) { return line + "|"; }

}  // namespace

void copyChildRows(host::Table& from, host::Champ& fromNumero, host::Table& to, const std::string& line,
                   const std::function<void()>& adjust) {
  from.initRequete();
  from.ajouteFiltre(fromNumero, '/', prefix(line));
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

void convertChildRows(host::Table& table, host::Champ& numero, const std::string& line,
                      std::initializer_list<host::Champ*> amounts,
                      const std::function<host::Decimal(const host::Decimal&)>& convert) {
  table.initRequete();
  table.ajouteFiltre(numero, '/', prefix(line));
  table.activeRequete();
  for (int rc = table.suivant(3); rc == 0; rc = table.suivant(1)) {
    for (host::Champ* amount : amounts) *amount = convert(amount->decimal());
    table.ecrit();
  }
  table.initRequete();
}

void removeChildRows(host::Table& table, host::Champ& numero, const std::string& line) {
  table.initRequete();
  table.ajouteFiltre(numero, '/', prefix(line));
  table.vide();
  table.initRequete();
}

}  // namespace model
