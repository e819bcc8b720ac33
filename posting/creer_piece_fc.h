// "MIRVAE-CREER_PIECE_FC": posts a saved client invoice to the ledger.
#pragma once

#include "posting/creer_piece.h"

class MIRVAECreer_piece_fc : public posting::PostingProcess {
 public:
  // `e` carries the IDENT of the operation to post.
  explicit MIRVAECreer_piece_fc(host::Evt* e);
};
