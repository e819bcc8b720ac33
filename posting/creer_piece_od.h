// "MIRVAE-CREER_PIECE_OD": posts a saved miscellaneous operation to the ledger.
//
// Such an operation has no header account: each line carries its own side (SENS_DC),
// so the piece has no counterpart and no due date, and it balances only if the user
// made the lines balance; the ledger refuses it whole otherwise.
#pragma once

#include "posting/creer_piece.h"

class MIRVAECreer_piece_od : public posting::PostingProcess {
 public:
  // `e` carries the IDENT of the operation to post.
  explicit MIRVAECreer_piece_od(host::Evt* e);

 protected:
  // The line's own side: "D" debit, anything else credit.
  posting::Side lineSide() override;
  // Purchase VAT codes take their deductible account; sales VAT follows the dossier's
  // basis, then the line account's, and is owed on debits when neither says.
  host::Valeur vatAccount() override;
  // A line is posted unless all its amounts are zero. A line on a VAT account makes
  // one movement of its VAT amount on that account; any other line makes its
  // excluding-tax movement, even of zero, and its VAT movement when it bears VAT.
  bool sendLine() override;
  bool sendCounterpart() override { return true; }

  host::Champ MIRVAL_SENS_DC{"SENS_DC", &MIRVAL};
  host::Champ MIRVAL_TTC{"TTC", &MIRVAL};
  host::Champ COMPT_NATUC{"NATUC", &COMPT};
  host::Champ CDTVA_TYTVA{"TYTVA", &CDTVA};
};
