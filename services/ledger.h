// The ledger's procedures of the accounting library that remove a posted piece.
#pragma once

namespace host {
class Automate;
}

namespace services {

// Adds "RESERVER_SUPPR_PIECE", "SUPPRIMER_PIECE" and "LIBERER_SUPPR_PIECE" to the
// branch table of the accounting library's procedure module.
void ajouterProceduresPieces(host::Automate& library);

}  // namespace services
