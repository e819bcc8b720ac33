// The ledger's procedures of the accounting library that remove a posted piece.
//
//   "RESERVER_SUPPR_PIECE" (flag by reference, NPIES)  reserves the piece for removal
//                                                      by this process; the flag gets 0,
//                                                      or why not (codes below)
//   "SUPPRIMER_PIECE" (NPIES, trace)                   removes the piece's PIECE, MOUVE,
//                                                      ECHEA and VTSEC rows; only under
//                                                      this process's reservation
//   "LIBERER_SUPPR_PIECE" ()                           releases this process's reservations
//
// The ledger never loses a validated or matched movement: a piece that is final,
// lettered, bank-reconciled or (partly) settled is neither reserved nor removed, and
// neither is one that another process holds reserved (PIECE_RESERVEE). The reservation
// needs the piece's number, so the caller passes it after the flag. SUPPRIMER_PIECE
// reports 0 when the piece is gone and 1 when it was left in place; the trace flag is
// accepted as sent, the ledger keeping no trace of a removed piece.
#pragma once

namespace host {
class Automate;
}

namespace services {

// Why a piece may not be removed (the reservation's flag).
enum RemovalRefusal {
  kHeldByAnother = 1,  // another process holds it reserved
  kFinal = 2,          // PIECE.IMPUT "O"
  kMatched = 3,        // a movement is lettered (RELET) or bank-reconciled (RRAPB)
  kSettled = 4,        // a due date is settled, wholly or in part (ECHEA.UNIQR)
  kUnknownPiece = 5,   // no such piece
};

// Adds "RESERVER_SUPPR_PIECE", "SUPPRIMER_PIECE" and "LIBERER_SUPPR_PIECE" to the
// branch table of the accounting library's procedure module, which must outlive them
// (one instance per session).
void ajouterProceduresPieces(host::Automate& library);

}  // namespace services
