#include "posting/creer_piece_fc.h"

MIRVAECreer_piece_fc::MIRVAECreer_piece_fc(host::Evt* e) : PostingProcess(e, registry::operationKind(1)) {
  registerBranches("CREER_LIGNE_TIERS");
}
