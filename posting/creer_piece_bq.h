// "MIRVAE-CREER_PIECE_BQ" and "MIRVAE-CREER_PIECE_CA": post a saved bank or cash
// operation to the ledger.
//
// The operation's direction (MIRVAE.TYPE_DR, "D" a payment out, anything else a
// receipt) gives the sides: a payment debits its lines and credits the bank or cash
// account, a receipt the other way. The counterpart on that account has no due date.
// Once the piece is posted, "FAIT_JUSTIFICATION" settles the due dates justified on
// the operation's lines.
#pragma once

#include <string>
#include <utility>
#include <vector>

#include "posting/creer_piece.h"

class MIRVAECreer_piece_bq : public posting::PostingProcess {
 public:
  // `e` carries the IDENT of the operation to post.
  explicit MIRVAECreer_piece_bq(host::Evt* e);

  // The settlement of the due dates justified on the operation: for each posted line
  // (an amount and its ledger movement), each of its justification rows (MIRVAJUS)
  // goes through "JUSTIFICATION_ECHEANCE". The differences of those settlements are
  // gathered in EAEUR, then posted and settled by the two procedures below.
  void fait_justification(host::Evt* e);
  // Settles one justified due date (the MIRVAJUS row in the buffer) by the line's
  // movement: its paid and remaining amounts, a due date for the rest of a partial
  // payment, its lettering group, and its rounding and exchange differences in EAEUR.
  // A due date that is gone, settled meanwhile or over-settled stops the posting
  // (HostError): the operation is saved with all its settlements or not at all.
  void justification_echeance(host::Evt* e);
  // One balanced piece per journal of EAEUR: each difference on the tiers account
  // against the loss or gain account of its kind.
  void fait_import_piece_eaeur(host::Evt* e);
  // Letters the tiers movements of the difference pieces with the settlements they
  // close, then every settlement group that now balances.
  void fait_justification_eaeur(host::Evt* e);

 protected: protected:
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
  host::Table ECHEA{this, "", "ECHEA", ""};
  host::Table ECHEA2{this, "", "ECHEA", "ECHEA2"};
  host::Table MOUVE1{this, "", "MOUVE", "MOUVE1"};
  host::Table MOUVE2{this, "", "MOUVE", "MOUVE2"};
  host::Table PIECE1{this, "", "PIECE", "PIECE1"};
  host::Champ MIRVAL_TTC{"TTC", &MIRVAL};
  host::Champ MOUVE_NUMCP{"NUMCP", &MOUVE};
  host::Champ MOUVE_MTDEB{"MTDEB", &MOUVE};
  host::Champ MOUVE_MTCRE{"MTCRE", &MOUVE};
  host::Champ MOUVE_RELET{"RELET", &MOUVE};
  host::Champ MOUVE1_UNIQ{"UNIQ", &MOUVE1};
  host::Champ MOUVE1_NLIGS{"NLIGS", &MOUVE1};
  host::Champ MOUVE1_NUMCP{"NUMCP", &MOUVE1};
  host::Champ MOUVE1_MTDEB{"MTDEB", &MOUVE1};
  host::Champ MOUVE1_MTCRE{"MTCRE", &MOUVE1};
  host::Champ MOUVE2_UNIQ{"UNIQ", &MOUVE2};
  host::Champ MOUVE2_NUMCP{"NUMCP", &MOUVE2};
  host::Champ MOUVE2_MTDEB{"MTDEB", &MOUVE2};
  host::Champ MOUVE2_MTCRE{"MTCRE", &MOUVE2};
  host::Champ MOUVE2_RELET{"RELET", &MOUVE2};
  host::Champ MOUVE2_DTLET{"DTLET", &MOUVE2};
  host::Champ PIECE1_NPIES{"NPIES", &PIECE1};
  host::Champ PIECE1_NPIEC{"NPIEC", &PIECE1};
  host::Champ PIECE1_MONNAIE_IDENT{"MONNAIE_IDENT", &PIECE1};
  host::Champ PIECE1_COURS{"COURS", &PIECE1};
  host::Champ PIECE1_DTPIE{"DTPIE", &PIECE1};
  host::Champ ECHEA_NUSYS{"NUSYS", &ECHEA};
  host::Champ ECHEA_UNIQ{"UNIQ", &ECHEA};
  host::Champ ECHEA_UNIQR{"UNIQR", &ECHEA};
  host::Champ ECHEA_MTECH{"MTECH", &ECHEA};
  host::Champ ECHEA_MTECHS{"MTECHS", &ECHEA};
  host::Champ ECHEA_MTPAY{"MTPAY", &ECHEA};
  host::Champ ECHEA_MTPAYS{"MTPAYS", &ECHEA};
  host::Champ ECHEA_MTRES{"MTRES", &ECHEA};
  host::Champ ECHEA_MTRESS{"MTRESS", &ECHEA};
  host::Champ ECHEA_RELET{"RELET", &ECHEA};
  host::Champ ECHEA2_UNIQ{"UNIQ", &ECHEA2};
  host::Champ ECHEA2_UNIQR{"UNIQR", &ECHEA2};
  host::Champ ECHEA2_MTPAY{"MTPAY", &ECHEA2};
  host::Champ ECHEA2_RELET{"RELET", &ECHEA2};
  host::Champ ECHEA2_NUSYS{"NUSYS", &ECHEA2};
  host::Champ EAEUR_NINST{"NINST", &EAEUR};
  host::Champ EAEUR_NUMJL{"NUMJL", &EAEUR};
  host::Champ EAEUR_NPICPTA{"NPICPTA", &EAEUR};
  host::Champ EAEUR_NUMCP{"NUMCP", &EAEUR};
  host::Champ EAEUR_LIBECR{"LIBECR", &EAEUR};
  host::Champ EAEUR_MONTANT{"MONTANT", &EAEUR};
  host::Champ EAEUR_SENS{"SENS", &EAEUR};
  host::Champ EAEUR_NUMENG{"NUMENG", &EAEUR};
  host::Champ PARAM_MONNAIE_IDENT{"MONNAIE_IDENT", &PARAM};
  host::Champ PARAM_PCECC{"PCECC", &PARAM};
  host::Champ PARAM_PCECP{"PCECP", &PARAM};
  host::Champ PARAM_PCEEC{"PCEEC", &PARAM};
  host::Champ PARAM_PCEEP{"PCEEP", &PARAM};
  host::Champ PARAM_PJOCHAN{"PJOCHAN", &PARAM};
  host::Champ PARAM_PJOEURO{"PJOEURO", &PARAM};
  host::Champ MIRVAJUS_MTREG{"MTREG", &MIRVAJUS};
  host::Champ MIRVAJUS_MTREGS{"MTREGS", &MIRVAJUS};
  host::Champ MIRVAJUS_MTEEUR{"MTEEUR", &MIRVAJUS};
  host::Champ MIRVAJUS_MTECHG{"MTECHG", &MIRVAJUS};

  // The settlement's own amounts, in keeping, invoice and settlement currency.
  host::Monnaie DBL_MT_ECHEANCE_EN_MONNAIE_TENUE{"DBL_MT_ECHEANCE_EN_MONNAIE_TENUE", "", "", 0, this};
  host::Monnaie DBL_MT_ECHEANCE_EN_MONNAIE_FACTURE{"DBL_MT_ECHEANCE_EN_MONNAIE_FACTURE", "", "", 0, this};
  host::Monnaie DBL_MT_REGT_EN_MONNAIE_TENUE{"DBL_MT_REGT_EN_MONNAIE_TENUE", "", "", 0, this};
  host::Monnaie DBL_MT_REGT_EN_MONNAIE_REGT{"DBL_MT_REGT_EN_MONNAIE_REGT", "", "", 0, this};
  host::Monnaie DBL_RESTE_A_PAYER_EN_MONNAIE_TENUE{"DBL_RESTE_A_PAYER_EN_MONNAIE_TENUE", "", "", 0, this};
  host::Monnaie DBL_RESTE_A_PAYER_EN_MONNAIE_FACTURE{"DBL_RESTE_A_PAYER_EN_MONNAIE_FACTURE", "", "", 0, this};

 private:
  // The line movement's keeping-currency amount shared out over the line's rows, so
  // that the shares add up to the movement to the cent: row by row MTREG, the last
  // row taking what the movement has beyond the others.
  host::Decimal lineShare();
  // The lettering group of the due date in ECHEA settled by the movement in MOUVE:
  // the group of the invoice's earlier settlements or of the movement's other ones
  // (two groups met are merged), else a new one.
  std::string settlementGroup();
  void renameGroup(const std::string& from, const std::string& to);
  // Letters the group for good when every due date of its invoices is settled.
  void closeGroupIfSettled(const std::string& group);
  // A difference of the settled due date `nusys`: positive when the invoice still had
  // that much open after the settlement.
  void addDifference(const char* journal, const char* label, const host::Decimal& amount, bool invoiceDebit,
                     long long nusys);
  // Stops the posting with `text`: nothing of the operation is saved.
  [[noreturn]] void stop(const std::string& text);

  const char* counterpart_;
  host::Decimal line_remaining_;  // the line movement's amount not yet shared out
  int line_rows_left_ = 0;
  std::vector<std::string> groups_;  // settlement groups touched by this posting
  std::vector<std::pair<long long, long long>> difference_movements_;  // (movement UNIQ, due date NUSYS)
};

class MIRVAECreer_piece_ca : public MIRVAECreer_piece_bq {
 public:
  // `e` carries the IDENT of the operation to post.
  explicit MIRVAECreer_piece_ca(host::Evt* e);
};
