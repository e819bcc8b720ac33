#include "posting/creer_piece_od.h"

MIRVAECreer_piece_od::MIRVAECreer_piece_od(host::Evt* e) : PostingProcess(e, registry::operationKind(6)) {
  registerBranches(nullptr);
}

posting::Side MIRVAECreer_piece_od::lineSide() {
  return MIRVAL_SENS_DC == "D" ? posting::Side::Debit : posting::Side::Credit;
}

host::Valeur MIRVAECreer_piece_od::vatAccount() {
  if (CDTVA_TYTVA != "V") return CDTVA_DETVA.valeur();
  return salesVatAccount(posting::VatBasis::Debits);
}

bool MIRVAECreer_piece_od::sendLine() {
  if (MIRVAL_HT.decimal().isZero() && MIRVAL_TVA.decimal().isZero() && MIRVAL_TTC.decimal().isZero()) return true;
  lireCompte(MIRVAL_NUMCP);
  if (COMPT_NATUC.chaine().find('T') != std::string::npos) {
    V_NUMCP = MIRVAL_NUMCP;
    return sendVatMovement();
  }
  if (!sendExcludingTaxMovement()) return false;
  return MIRVAL_TVA.decimal().isZero() || sendVatOfCode();
}
