#include "posting/verifier_modif_piece.h"

using namespace host;

MIRVAEVerifier_modif_piece::MIRVAEVerifier_modif_piece(Evt* e) : Traitmnt(e) {
  nomBase("CP");
  nomLibelles("LIBE1", "LIBEL");
  nomTable("MIRVAE", nullptr);
  lancement()->param(0, P_FLAG_E, 1);
  lancement()->param(1, P_NPIES, 0);
  addBranch("DEBUT", &MIRVAEVerifier_modif_piece::debut);
  addBranch("FAIRE", &MIRVAEVerifier_modif_piece::faire);
}

void MIRVAEVerifier_modif_piece::debut(Evt* e) {
  if (PARAM.lit(3, PARAM_PNUME, '=', Valeur::entier(1)) != 0) sortir(e, 0);
}

void MIRVAEVerifier_modif_piece::faire(Evt* e) {
  P_FLAG_E = 0;
  if (P_NPIES.estVide()) return sortir(e, 0);
  if (PIECE.lit(3, PIECE_NPIES, '=', P_NPIES) != 0) {
    P_FLAG_E = -1;
    return sortir(e, 0);
  }
  if (PIECE_IMPUT == "O") {
    refuser("Cette pièce est validée définitivement.@La modification est impossible !");
    return sortir(e, 0);
  }

  lireMouvements();
  for (int rc = MOUVE.suivant(3); rc == 0; rc = MOUVE.suivant(1)) {
    if (!MOUVE_RELET.estVide() || !MOUVE_RRAPB.estVide()) {
      refuser("Cette pièce contient un mouvement lettré ou pointé.@La modification est impossible !");
      break;
    }
  }

  if (P_FLAG_E == 0) {
    lireMouvements();
    for (int rc = MOUVE.suivant(3); rc == 0 && P_FLAG_E == 0; rc = MOUVE.suivant(1)) {
      ECHEA.initRequete();
      ECHEA.ajouteFiltre(ECHEA_INDX1, '=', MOUVE_UNIQ);
      ECHEA.activeRequete();
      for (int due = ECHEA.suivant(3); due == 0; due = ECHEA.suivant(1)) {
        if (!(ECHEA_UNIQR == 0)) {
          refuser("Cette pièce est totalement ou partiellement réglée.@La modification est impossible !");
          break;
        }
      }
    }
  }

  // A piece that may change leaves the end of the process to the model's course.
  if (P_FLAG_E == 1) sortir(e, 0);
}

void MIRVAEVerifier_modif_piece::refuser(const char* message) {
  P_FLAG_E = 1;
  EvtParamVal texte(1, message);
  appelerProcedure("*", "CPMESSAG", "INTERFACE", "MESS_OK", &texte, -1);
}

// The piece's movements: their NLIGS begins with its number.
void MIRVAEVerifier_modif_piece::lireMouvements() {
  MOUVE.initRequete();
  MOUVE.ajouteFiltre(MOUVE_NLIGS, '/', PIECE_NPIES);
  MOUVE.choisitIndex("NLIGS");
  MOUVE.activeRequete();
}
