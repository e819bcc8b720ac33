// The ledger of a dossier, for a person and for other tools.
#pragma once

#include <ostream>

#include "host/database.h"

namespace app {

// Both write the ledger whole or not at all: a stored value that cannot be written
// out as it is (an amount or a date that is not one, a text that is not clean UTF-8)
// is a HostError naming its table, row and column, and nothing is written to `out`.

// Pieces in number order, each with its movements and due dates, in columns.
void imprimerGrandLivre(host::Database& db, std::ostream& out);

// The ledger as an hledger journal: one transaction per piece (date, number, label),
// one posting per movement, amounts in the keeping currency.
void exporterHledger(host::Database& db, std::ostream& out);

}  // namespace app
