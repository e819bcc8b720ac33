// "MIRVAE-CREER_PIECE_FF" and "MIRVAE-CREER_PIECE_NDF": post a saved supplier invoice
// or staff expense note to the ledger. Both post as purchases: the expenses and the
// deductible VAT on the debit, the supplier or employee on the credit with the due date.
#pragma once

#include "posting/creer_piece.h"

class MIRVAECreer_piece_ff : public posting::PostingProcess {
 public:
  // `e` carries the IDENT of the operation to post.
  explicit MIRVAECreer_piece_ff(host::Evt* e);

 protected:
  // For the expense note, which posts the same way.
  MIRVAECreer_piece_ff(host::Evt* e, int kind);

  posting::Side lineSide() override { return posting::Side::Debit; }
  // The deductible VAT of the line's code, whatever the dossier's VAT basis.
  host::Valeur vatAccount() override { return CDTVA_DETVA.valeur(); }
};

class MIRVAECreer_piece_ndf : public MIRVAECreer_piece_ff {
 public:
  // `e` carries the IDENT of the operation to post.
  explicit MIRVAECreer_piece_ndf(host::Evt* e);
};
