#include "posting/creer_piece_fc.h"

MIRVAECreer_piece_fc::MIRVAECreer_piece_fc(host::Evt* e) : PostingProcess(e, registry::operationKind(1)) {
  addBranch("DEBUT", &MIRVAECreer_piece_fc::debut);
  addBranch("FAIRE", &MIRVAECreer_piece_fc::faire);
  addBranch("FAIT_IMPORT_PIECE", &MIRVAECreer_piece_fc::fait_import_piece);
  addBranch("CREER_ENTETE", &MIRVAECreer_piece_fc::creer_entete);
  addBranch("CREER_LIGNE_HT", &MIRVAECreer_piece_fc::creer_ligne_ht);
  addBranch("CREER_LIGNE_TVA", &MIRVAECreer_piece_fc::creer_ligne_tva);
  addBranch("CREER_LIGNE_TIERS", &MIRVAECreer_piece_fc::creer_ligne_tiers);
  addBranch("CREER_ECHEANCE", &MIRVAECreer_piece_fc::creer_echeance);
  addBranch("CREER_ANALYTIQUE", &MIRVAECreer_piece_fc::creer_analytique);
  addBranch("TRAITER_ERREUR", &MIRVAECreer_piece_fc::traiter_erreur);
}

host::Valeur MIRVAECreer_piece_fc::vatAccount() {
  if (PARAM_PMTVA == "D") return CDTVA_CITVA.valeur();
  if (PARAM_PMTVA == "E") return CDTVA_CETVA.valeur();
  return COMPT_TPTVA == "D" ? CDTVA_CITVA.valeur() : CDTVA_CETVA.valeur();
}
