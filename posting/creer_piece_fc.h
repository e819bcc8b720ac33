// "MIRVAE-CREER_PIECE_FC": posts a saved client invoice to the ledger.
#pragma once

#include "posting/creer_piece.h"

class MIRVAECreer_piece_fc : public posting::PostingProcess {
 public:
  // `e` carries the IDENT of the operation to post.
  explicit MIRVAECreer_piece_fc(host::Evt* e);

 protected:
  // Revenue and VAT on credit, the client on debit.
  posting::Side lineSide() override { return posting::Side::Credit; }
  // Sales VAT, owed on receipts unless the dossier or the line account says debits.
  host::Valeur vatAccount() override { return salesVatAccount(posting::VatBasis::Receipts); }
};
