// "MIRVAE-SUPPRIMER_PIECE": removes from the ledger the piece an operation was posted
// as, before the operation is posted again.
//
// Parameters (by value): the piece number NPIES, and the trace flag handed on to the
// ledger ("N" from the entry screens). An empty or unknown number does nothing. The
// piece is removed only under the ledger's reservation; a refused reservation (a
// piece final, lettered, reconciled, settled, or held by another process) leaves it in
// place without a word.
#pragma once

#include "host/table.h"
#include "model/traitmnt.h"

class MIRVAESupprimer_piece : public model::Traitmnt {
 public:
  explicit MIRVAESupprimer_piece(host::Evt* e);

  void debut(host::Evt* e) override;
  void faire(host::Evt* e) override;

 private:
  host::Chaine P_NPIES{"P_NPIES", "", "", 0, this};
  host::Chaine P_TRACE{"P_TRACE", "", "", 0, this};
  host::Entier V_FLAG_E{"V_FLAG_E", "", "", 0, this};

  host::Table PARAM{this, "", "PARAM", ""};
  host::Table PIECE{this, "", "PIECE", ""};

  host::Champ PARAM_PNUME{"PNUME", &PARAM};
  host::Champ PIECE_NPIES{"NPIES", &PIECE};
};
