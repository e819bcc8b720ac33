// "MIRVAE-VERIFIER_MODIF_PIECE": tells an entry screen whether the ledger piece of an
// operation may still be changed, and tells the user why not.
//
// Parameters: an Entier by reference that receives the result, then the piece number
// NPIES by value. Result 0: the piece may change (also when NPIES is empty); 1: it may
// not, and the user has been shown the first reason found (final, then lettered or
// reconciled, then settled); -1: no piece has that number.
#pragma once

#include "host/table.h"
#include "model/traitmnt.h"

class MIRVAEVerifier_modif_piece : public model::Traitmnt {
 public:
  explicit MIRVAEVerifier_modif_piece(host::Evt* e);

  void debut(host::Evt* e) override;
  void faire(host::Evt* e) override;

 private:
  void refuser(const char* message);
  void lireMouvements();

  host::Entier P_FLAG_E{"P_FLAG_E", "", "", 0, this};
  host::Chaine P_NPIES{"P_NPIES", "", "", 0, this};

  host::Table PARAM{this, "", "PARAM", ""};
  host::Table PIECE{this, "", "PIECE", ""};
  host::Table MOUVE{this, "", "MOUVE", ""};
  host::Table ECHEA{this, "", "ECHEA", ""};

  host::Champ PARAM_PNUME{"PNUME", &PARAM};
  host::Champ PIECE_NPIES{"NPIES", &PIECE};
  host::Champ PIECE_IMPUT{"IMPUT", &PIECE};
  host::Champ MOUVE_NLIGS{"NLIGS", &MOUVE};
  host::Champ MOUVE_RELET{"RELET", &MOUVE};
  host::Champ MOUVE_RRAPB{"RRAPB", &MOUVE};
  host::Champ MOUVE_UNIQ{"UNIQ", &MOUVE};
  host::Champ ECHEA_INDX1{"INDX1", &ECHEA};
  host::Champ ECHEA_UNIQR{"UNIQR", &ECHEA};
};
