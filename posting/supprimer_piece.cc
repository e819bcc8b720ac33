#include "posting/supprimer_piece.h"

using namespace host;

MIRVAESupprimer_piece::MIRVAESupprimer_piece(Evt* e) : Traitmnt(e) {
  nomBase("CP");
  nomLibelles("LIBE1", "LIBEL");
  nomTable("MIRVAE", nullptr);
  lancement()->param(0, P_NPIES, 0);
  lancement()->param(1, P_TRACE, 0);
  addBranch("DEBUT", &MIRVAESupprimer_piece::debut);
  addBranch("FAIRE", &MIRVAESupprimer_piece::faire);
}

void MIRVAESupprimer_piece::debut(Evt* e) {
  if (PARAM.lit(3, PARAM_PNUME, '=', Valeur::entier(1)) != 0) sortir(e, 0);
}

void MIRVAESupprimer_piece::faire(Evt* e) {
  if (!P_NPIES.estVide() && PIECE.lit(3, PIECE_NPIES, '=', P_NPIES) == 0) {
    // Refused until the ledger says otherwise.
    V_FLAG_E = 1;
    // The ledger needs to know which piece to reserve: its number follows the flag.
    EvtParamRef reserver(2, &V_FLAG_E, &P_NPIES);
    appelerProcedure("COMPTA", "COMPTA", "MOD_CAL_BIBLIOPROC", "RESERVER_SUPPR_PIECE", &reserver, -1);
    if (V_FLAG_E == 0) {
      EvtParamRef supprimer(2, &P_NPIES, &P_TRACE);
      appelerProcedure("COMPTA", "COMPTA", "MOD_CAL_BIBLIOPROC", "SUPPRIMER_PIECE", &supprimer, -1);
      EvtParamVal liberer(new InfoCode(0, 0, 0, 0, 0, 0));
      appelerProcedure("COMPTA", "COMPTA", "MOD_CAL_BIBLIOPROC", "LIBERER_SUPPR_PIECE", &liberer, -1);
    }
  }
  sortir(e, 0);
}
