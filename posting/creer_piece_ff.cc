#include "posting/creer_piece_ff.h"

MIRVAECreer_piece_ff::MIRVAECreer_piece_ff(host::Evt* e) : MIRVAECreer_piece_ff(e, 2) {}

MIRVAECreer_piece_ff::MIRVAECreer_piece_ff(host::Evt* e, int kind) : PostingProcess(e, registry::operationKind(kind)) {
  registerBranches("CREER_LIGNE_TIERS");
}

MIRVAECreer_piece_ndf::MIRVAECreer_piece_ndf(host::Evt* e) : MIRVAECreer_piece_ff(e, 3) {}
