#include "posting/creer_piece_od.h"

MIRVAECreer_piece_od::MIRVAECreer_piece_od(host::Evt* e) : PostingProcess(e, registry::operationKind(6)) {
  enregistrerBranches(nullptr);
}

posting::Side MIRVAECreer_piece_od::lineSide() {
  return MIRVAL_SENS_DC == "D" ? posting::Side::Debit : posting::Side::Credit;
}

host::Valeur MIRVAECreer_piece_od::vatAccount() {
  if (CDTVA_TYTVA != "V") return CDTVA_DETVA.valeur();
  return compteTvaCollectee(posting::VatBasis::Debits);
}

bool MIRVAECreer_piece_od::envoyerLigne() {
  if (MIRVAL_HT.decimal().isZero() && MIRVAL_TVA.decimal().isZero() && MIRVAL_TTC.decimal().isZero()) return true;
  lireCompte(MIRVAL_NUMCP);
  if (COMPT_NATUC.chaine().find('T') != std::string::npos) {
    V_NUMCP = MIRVAL_NUMCP;
    return envoyerMouvementTva();
  }
  if (!envoyerMouvementHt()) return false;
  return MIRVAL_TVA.decimal().isZero() || envoyerTvaDuCode();
}
