// The justification of one settlement line of a bank or cash operation: the open due
// dates of the line's account that it may settle, listed one row each in the work
// table MIRVAJUS_M02, and what the user settles of each. On validation the settled
// rows go to the session's MIRVAJUS_M01, keyed by the line's IDENT, for the entry
// screen to keep with the operation; the posting settles them in the ledger.
//
// Three currencies meet: the dossier's keeping currency, the currency of the piece
// that carries the due date and the settlement currency (the operation's). A row
// holds the settled amount as typed (MTREGS, settlement currency), in keeping
// currency (MTREG), the rounding difference (MTEEUR) and the exchange difference
// (MTECHG, only when the currencies allow one), all with the due date's sign.
#pragma once

#include <string>
#include <vector>

#include "host/decimal.h"
#include "host/table.h"
#include "model/traitecr.h"

namespace justification {

class MIRVAEGest_jus : public model::Traitecr, public model::FreeList {
 public:
  // `e` carries the launch parameters in the order of the members below, P_RETOUR by
  // reference; the entry screens pass the first ten.
  explicit MIRVAEGest_jus(host::Evt* e);

  void debut(host::Evt* e) override;
  void ctrl_actualiser_mode(host::Evt* e);
  void lecture_echeances_reglees(host::Evt* e);
  void lecture_echeances_a_regler(host::Evt* e);
  void analyse_situation_justification(host::Evt* e);
  void calcul_echeance_monnaie_rgt_tenue(host::Evt* e);
  void lst_selection(host::Evt* e);
  void lst_debut_ligne(host::Evt* e);
  void lire_lst(host::Evt* e);
  void ctrl_debut_modif(host::Evt* e) override;
  void annulation_justification(host::Evt* e);
  void calcul_total_regle(host::Evt* e);
  void lst_mirvajus_m02_mtregs(host::Evt* e);
  void lst_mirvajus_m02_mtreg(host::Evt* e);
  void justification_monnaie_out(host::Evt* e);
  void bt_mt_reglement(host::Evt* e);
  void bt_solde(host::Evt* e);
  void valid(host::Evt* e);
  void aband(host::Evt* e);

  // model::FreeList
  std::string listName() const override { return "LST"; }
  std::vector<model::RowText> rows() override;
  bool goToRow(int n) override;

  // ---- launch parameters
  host::Chaine V_IDENTR{"V_IDENTR", "N° ligne du Règlement", "", 0, this};
  host::Chaine V_TYPJL{"V_TYPJL", "Type du journal du mouvement V_IDENTR", "", 0, this};
  host::Chaine V_TYPCPT{"V_TYPCPT", "Type du compte (T)iers ou Effet à (R)ecevoir ou Effet à Payer (S)", "", 0, this};
  host::Chaine V_NUMCP{"V_NUMCP", "N° compte de tiers ou d'effet", "", 0, this};
  host::Monnaie V_MTDEB{"V_MTDEB", "Montant Débit Règlement", "", 0, this};
  host::Monnaie V_MTCRE{"V_MTCRE", "Montant Crédit Règlement", "", 0, this};
  host::Date V_DEBEX{"V_DEBEX", "Date début exercice", "8", 0, this};
  host::Date P_DTOPE{"P_DTOPE", "Date de la pièce", "8", 0, this};
  host::Chaine P_MONNAIE_RGT{"P_MONNAIE_RGT", "Identifiant monnaie de règlement", "", 0, this};
  host::Double P_COURS{"P_COURS", "Cours de la monnaie de règlement", "", 0, this};
  host::Chaine P_RETOUR{"P_RETOUR", "sera égal à VALIDATION si validation de la justification / sinon égal à vierge",
                        "", 0, this};

  // ---- screen variables
  host::Entier V_CHOIX{"V_CHOIX", "Choix dans boite dialogue", "", 0, this};
  host::Monnaie V_TOTAL_REGT{"V_TOTAL_REGT", "Total justifié", "", 0, this};
  host::Monnaie V_RESTE_A_JUSTIF{"V_RESTE_A_JUSTIF", "Reste à justifier", "", 0, this};
  host::Monnaie V_MT_A_JUSTIF{"V_MT_A_JUSTIF", "Règlement à justifier", "", 0, this};
  host::Double V_MTECH{"V_MTECH", "Montant échéance monnaie de tenue", "", 0, this};
  host::Double V_MTECHS{"V_MTECHS", "Montant échéance monnaie de saisie", "", 0, this};
  host::Double V_EEUR{"V_EEUR", "Montant écart échéance monnaie de tenue", "", 0, this};
  host::Chaine V_REGT_JUSTIF{"V_REGT_JUSTIF", "Règlement justifié O/N", "", 0, this};
  host::Chaine LIB_DEC_ENC{"LIB_DEC_ENC", "Libellé en-tete écran", "", 0, this};
  host::Double MSK_MTPIE{"MSK_MTPIE", "Montant net à payer de la pièce <facture> monnaie de tenue", "", 0, this};
  host::Chaine V_FLAG_MODIF{"V_FLAG_MODIF", "Justification modifiée O/N", "", 0, this};
  host::Chaine V_JOURNAL_COMPTE{"V_JOURNAL_COMPTE", "Concaténation Type journal et Type compte", "", 0, this};
  host::Chaine V_TYPE_MT_A_JUSTIF{"V_TYPE_MT_A_JUSTIF", "Type de montant à justifier D/C", "", 0, this};
  host::Chaine V_MONNAIE_RGT{"V_MONNAIE_RGT", "Identifiant Monnaie de règlement en cours", "", 0, this};
  host::Chaine V_MONNAIE_TENUE{"V_MONNAIE_TENUE", "Identifiant Monnaie de tenue du dossier", "", 0, this};
  host::Chaine V_MONNAIE_PIECE{"V_MONNAIE_PIECE",
                               "Identifiant de la monnaie de la pièce dont l' échéance est à justifier", "", 0, this};
  host::Entier V_FLAG_COL{"V_FLAG_COL", "Témoin colonne table de décision", "", 0, this};
  host::Date V_DATE_PIECE{"V_DATE_PIECE", "Date de la pièce dont l'échéance est à justifier", "", 0, this};
  host::Double V_COURS_PIECE{"V_COURS_PIECE", "Cours de la pièce dont l'échéance est à justifier", "", 0, this};
  host::Date V_DATE_COURS{"V_DATE_COURS", "Date du cours de la monnaie", "8", 0, this};
  host::Double V_MTRGT_DTRGT{"V_MTRGT_DTRGT",
                             "Montant règlement en monnaie de tenue calculé au cours de la saisie du règlement", "",
                             0, this};
  host::Double V_MTRGT_COURS_PIECE{"V_MTRGT_COURS_PIECE",
                                   "Montant règlement en monnaie de tenue calculé au cours de la pièce", "", 0, this};
  host::Double V_MT_SAISIE{"V_MT_SAISIE", "Valeur Reelle montant rgt saisi", "", 0, this};
  host::Monnaie V_CHAMP_MONNAIE{"V_CHAMP_MONNAIE", "", "", 0, this};

  // ---- tables
  host::Table MIRVAJUS_M02{this, "", "MIRVAJUS_M02", ""};
  host::Table MIRVAJUS_M02A{this, "", "MIRVAJUS_M02", "MIRVAJUS_M02A"};
  host::Table MIRVAJUS_M01{this, "", "MIRVAJUS_M01", ""};
  host::Table MIRVAJUS_M01A{this, "", "MIRVAJUS_M01", "MIRVAJUS_M01A"};
  host::Table ECHEA{this, "", "ECHEA", ""};
  host::Table MOUVE{this, "", "MOUVE", ""};
  host::Table MOUVE2{this, "", "MOUVE", "MOUVE2"};
  host::Table PIECE{this, "", "PIECE", ""};
  host::Table JONAL{this, "", "JONAL", ""};
  host::Table PARAM{this, "", "PARAM", ""};

  // ---- fields
  host::Champ M02_NUSYS{"NUSYS", &MIRVAJUS_M02};
  host::Champ M02_UNIQ{"UNIQ", &MIRVAJUS_M02};
  host::Champ M02_DTECH{"DTECH", &MIRVAJUS_M02};
  host::Champ M02_DTOPE{"DTOPE", &MIRVAJUS_M02};
  host::Champ M02_NPIES{"NPIES", &MIRVAJUS_M02};
  host::Champ M02_NPIEC{"NPIEC", &MIRVAJUS_M02};
  host::Champ M02_MTREG{"MTREG", &MIRVAJUS_M02};
  host::Champ M02_MTREGS{"MTREGS", &MIRVAJUS_M02};
  host::Champ M02_MTEEUR{"MTEEUR", &MIRVAJUS_M02};
  host::Champ M02_MTECHG{"MTECHG", &MIRVAJUS_M02};
  host::Champ M02_FLAG_CHG{"FLAG_CHG", &MIRVAJUS_M02};
  host::Champ M02A_MTREGS{"MTREGS", &MIRVAJUS_M02A};
  host::Champ M01_IDENTR{"IDENTR", &MIRVAJUS_M01};
  host::Champ M01_NUSYS{"NUSYS", &MIRVAJUS_M01};
  host::Champ M01_MTREG{"MTREG", &MIRVAJUS_M01};
  host::Champ M01_MTREGS{"MTREGS", &MIRVAJUS_M01};
  host::Champ M01_MTEEUR{"MTEEUR", &MIRVAJUS_M01};
  host::Champ M01_MTECHG{"MTECHG", &MIRVAJUS_M01};
  host::Champ M01A_NUSYS{"NUSYS", &MIRVAJUS_M01A};
  host::Champ ECHEA_NUSYS{"NUSYS", &ECHEA};
  host::Champ ECHEA_UNIQ{"UNIQ", &ECHEA};
  host::Champ ECHEA_UNIQR{"UNIQR", &ECHEA};
  host::Champ ECHEA_DTECH{"DTECH", &ECHEA};
  host::Champ ECHEA_MTECH{"MTECH", &ECHEA};
  host::Champ ECHEA_MTECHS{"MTECHS", &ECHEA};
  host::Champ ECHEA_ECART{"ECART", &ECHEA};
  host::Champ MOUVE_UNIQ{"UNIQ", &MOUVE};
  host::Champ MOUVE_DTOPE{"DTOPE", &MOUVE};
  host::Champ MOUVE_NLIGS{"NLIGS", &MOUVE};
  host::Champ MOUVE_MTDEB{"MTDEB", &MOUVE};
  host::Champ MOUVE_MTCRE{"MTCRE", &MOUVE};
  host::Champ MOUVE_INDX2{"INDX2", &MOUVE};
  host::Champ MOUVE_RELET{"RELET", &MOUVE};
  host::Champ MOUVE_NUMJL{"NUMJL", &MOUVE};
  host::Champ MOUVE_JLNOR{"JLNOR", &MOUVE};
  host::Champ MOUVE2_UNIQ{"UNIQ", &MOUVE2};
  host::Champ MOUVE2_DTOPE{"DTOPE", &MOUVE2};
  host::Champ MOUVE2_NLIGS{"NLIGS", &MOUVE2};
  host::Champ PIECE_NPIES{"NPIES", &PIECE};
  host::Champ PIECE_NPIEC{"NPIEC", &PIECE};
  host::Champ PIECE_MONNAIE_IDENT{"MONNAIE_IDENT", &PIECE};
  host::Champ PIECE_COURS{"COURS", &PIECE};
  host::Champ PIECE_DTPIE{"DTPIE", &PIECE};
  host::Champ PIECE_NUMJL{"NUMJL", &PIECE};
  host::Champ JONAL_NUMJL{"NUMJL", &JONAL};
  host::Champ JONAL_TYPJL{"TYPJL", &JONAL};
  host::Champ PARAM_PNUME{"PNUME", &PARAM};
  host::Champ PARAM_MONNAIE_IDENT{"MONNAIE_IDENT", &PARAM};

 private:
  void messageOk(const std::string& text);
  bool question(const std::string& text);
  void leave(host::Evt* e);
  // Reports a table failure through the module library, with its step.
  void tableError(const char* step, int failure);
  void selectLineRows(host::Table& rows, host::Champ& identr);
  // Deletes the working rows of the line; `step` names a failure.
  void deleteLineRows(const char* step);
  // The due date's figures: V_MTECH, V_EEUR and the piece's currency, rate and date.
  void loadFigures();
  // `amount` of currency `from` in currency `to`, the settlement currency at P_COURS
  // and the piece's at its own rate when `atPieceRate`, rounded to `to`.
  host::Decimal convert(const host::Decimal& amount, const std::string& from, const std::string& to,
                        bool atPieceRate) const;
  host::Decimal round(const host::Decimal& amount, const std::string& currency) const;
  // The net amount of the due date's piece, on the side the settlement clears.
  host::Decimal netOfPiece();
  void recomputeRemainder();
  // The exchange difference of the row in the list buffer.
  void exchangeDifference();
  // Writes the row in the list buffer (a new one when it was blanked); `step` names a
  // failure.
  void writeRow(const char* step);
  // The due date's amount as the screen shows it: negative when its piece nets
  // against the settlement.
  host::Decimal shownDueAmount(host::Champ& amount);

  host::Decimal eeech_;  // conversion difference of the due date, settlement currency
};

}  // namespace justification
