#include "posting/creer_piece_bq.h"

#include "host/error.h"

MIRVAECreer_piece_bq::MIRVAECreer_piece_bq(host::Evt* e) : MIRVAECreer_piece_bq(e, 4, "CREER_LIGNE_BANQUE") {}

MIRVAECreer_piece_bq::MIRVAECreer_piece_bq(host::Evt* e, int kind, const char* counterpart)
    : PostingProcess(e, registry::operationKind(kind)), counterpart_(counterpart) {
  registerBranches(counterpart);
  addBranch("FAIT_JUSTIFICATION", &MIRVAECreer_piece_bq::fait_justification);
  addBranch("JUSTIFICATION_ECHEANCE", &MIRVAECreer_piece_bq::justification_echeance);
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

void MIRVAECreer_piece_bq::fait_justification(host::Evt*) {
  EAEUR.initRequete();
  EAEUR.vide();
  if (V_NPIES.estVide() || PIECE.lit(3, PIECE_NPIES, '=', V_NPIES) != 0) return;
  MIRVAL.initRequete();
  MIRVAL.ajouteFiltre(MIRVAL_NUMERO, '/', MIRVAE_IDENT.chaine() + "|");
  MIRVAL.choisitIndex("NUMERO");
  MIRVAL.activeRequete();
  for (int rc = MIRVAL.suivant(3); rc == 0; rc = MIRVAL.suivant(1)) {
    if (MIRVAL_HT == 0 || MOUVE.lit(3, MOUVE_UNIQ, '=', MIRVAL_MOUVE_UNIQ) != 0) continue;
    MIRVAJUS.initRequete();
    MIRVAJUS.ajouteFiltre(MIRVAJUS_IDENTR, '=', MIRVAL_IDENT.chaine());
    MIRVAJUS.activeRequete();
    for (int row = MIRVAJUS.suivant(3); row == 0; row = MIRVAJUS.suivant(1)) procedure("JUSTIFICATION_ECHEANCE");
    MIRVAJUS.initRequete();
  }
  MIRVAL.initRequete();
}

void MIRVAECreer_piece_bq::justification_echeance(host::Evt*) {
  throw host::HostError("L'échéance n° " + MIRVAJUS_NUSYS.chaine() +
                        " est justifiée sur cette opération, mais le règlement des échéances n'est pas encore "
                        "possible : l'opération n'est pas enregistrée.");
}

MIRVAECreer_piece_ca::MIRVAECreer_piece_ca(host::Evt* e) : MIRVAECreer_piece_bq(e, 5, "CREER_LIGNE_CAISSE") {}
