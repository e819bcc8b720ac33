// The ledger of a dossier, for a person and for other tools.
#pragma once

#include <ostream>

#include "host/database.h"

namespace app {

// Pieces in number order, each with its movements and due dates, in columns.
void imprimerGrandLivre(host::Database& db, std::ostream& out);

// The ledger as an hledger journal: one transaction per piece (date, number, label),
// one posting per movement, amounts in the keeping currency.
void exporterHledger(host::Database& db, std::ostream& out);

}  // namespace app
