#include "posting/creer_piece_bq.h"

MIRVAECreer_piece_bq::MIRVAECreer_piece_bq(host::Evt* e) : MIRVAECreer_piece_bq(e, 4, "CREER_LIGNE_BANQUE") {}

MIRVAECreer_piece_bq::MIRVAECreer_piece_bq(host::Evt* e, int kind, const char* counterpart)
    : PostingProcess(e, registry::operationKind(kind)), counterpart_(counterpart) {
  registerBranches(counterpart);
  addBranch("FAIT_JUSTIFICATION", &MIRVAECreer_piece_bq::fait_justification);
}

posting::Side MIRVAECreer_piece_bq::lineSide() {
  return MIRVAE_TYPE_DR == "D" ? posting::Side::Debit : posting::Side::Credit;
}

host::Valeur MIRVAECreer_piece_bq::vatAccount() {
  if (MIRVAE_TYPE_DR == "D") return CDTVA_DETVA.valeur();
  return salesVatAccount(posting::VatBasis::Debits);
}

bool MIRVAECreer_piece_bq::sendCounterpart() {
  lireCompte(MIRVAE_NUMCP);
  procedure(counterpart_);
  if (!importer("DEBUT_LIGNE")) return false;
  if (!importer("FIN_LIGNE")) return false;
  MOUVE_IMM.raz('N');
  return true;
}

void MIRVAECreer_piece_bq::afterPiece() { procedure("FAIT_JUSTIFICATION"); }

void MIRVAECreer_piece_bq::fait_justification(host::Evt*) {}

MIRVAECreer_piece_ca::MIRVAECreer_piece_ca(host::Evt* e) : MIRVAECreer_piece_bq(e, 5, "CREER_LIGNE_CAISSE") {}
