// "MIRVAE-CREER_PIECE_BQ" and "MIRVAE-CREER_PIECE_CA": post a saved bank or cash
// operation to the ledger.
//
// The operation's direction (MIRVAE.TYPE_DR, "D" a payment out, anything else a
// receipt) gives the sides: a payment debits its lines and credits the bank or cash
// account, a receipt the other way. The counterpart on that account has no due date.
// Once the piece is posted, "FAIT_JUSTIFICATION" settles the due dates justified on
// the operation's lines.
#pragma once

#include "posting/creer_piece.h"

class MIRVAECreer_piece_bq : public posting::PostingProcess {
 public:
  // `e` carries the IDENT of the operation to post.
  explicit MIRVAECreer_piece_bq(host::Evt* e);

  // The settlement of the due dates justified on the operation: for each posted line
  // (an amount and its ledger movement), each of its justification rows (MIRVAJUS)
  // goes through "JUSTIFICATION_ECHEANCE". The differences of those settlements are
  // gathered in EAEUR, emptied first.
  void fait_justification(host::Evt* e);
  // Settles one justified due date. Until settlements can be made, a justified due
  // date refuses the save: the operation is not posted without its settlements.
  void justification_echeance(host::Evt* e);

 protected:
  // For the cash operation, which posts the same way; `counterpart` names the
  // procedure that writes the counterpart row.
  MIRVAECreer_piece_bq(host::Evt* e, int kind, const char* counterpart);

  posting::Side lineSide() override;
  // A payment takes the deductible VAT; a receipt the sales VAT by the dossier's basis,
  // then the line account's, owed on debits when neither says.
  host::Valeur vatAccount() override;
  bool sendCounterpart() override;
  void afterPiece() override;

  host::Champ MIRVAE_TYPE_DR{this, "TYPE_DR", table(false)};
  host::Table PIECE{this, "", "PIECE", ""};
  host::Table MOUVE{this, "", "MOUVE", ""};
  host::Table MIRVAJUS{this, "", "MIRVAJUS", ""};
  host::Table EAEUR{this, "", "EAEUR", ""};
  host::Champ PIECE_NPIES{"NPIES", &PIECE};
  host::Champ MOUVE_UNIQ{"UNIQ", &MOUVE};
  host::Champ MIRVAJUS_IDENTR{"IDENTR", &MIRVAJUS};
  host::Champ MIRVAJUS_NUSYS{"NUSYS", &MIRVAJUS};

 private:
  const char* counterpart_;
};

class MIRVAECreer_piece_ca : public MIRVAECreer_piece_bq {
 public:
  // `e` carries the IDENT of the operation to post.
  explicit MIRVAECreer_piece_ca(host::Evt* e);
};
