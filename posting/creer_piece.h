// The posting of a saved operation to the ledger, shared by the six posting processes.
//
// A posting process reads one operation (MIRVAE header, MIRVAL lines, MIRVAANA
// analytic rows) and hands it to the ledger's import component "CPPIECE"/"INTERFACE"
// row by row: it writes one transfer row (PIECE_IMM, MOUVE_IMM, ECHEA_IMM, VTSEC_IMM)
// and calls the procedure that consumes it, in this order:
//
//   DEBUT_IMPORT; piece header, DEBUT_PIECE (the new number goes into MIRVAE.NPIES);
//   per line in key order, unless its HT is zero: excluding-tax movement, DEBUT_LIGNE
//   (its identifier goes into MIRVAL.MOUVE_UNIQ), each analytic row and ANALYTIQUE,
//   FIN_LIGNE; then, when the line bears VAT, the VAT movement, DEBUT_LIGNE, FIN_LIGNE;
//   the counterpart movement, DEBUT_LIGNE, its due date and ECHEANCE, FIN_LIGNE;
//   FIN_PIECE ("O"); FIN_IMPORT.
//
// A failure inside the lines ends the lines and goes on with the counterpart; any
// other failure stops the import. Each failure goes to "TRAITER_ERREUR", which shows
// the ledger's texts when the code is 10. The process never writes the ledger itself.
//
// What differs between the kinds of operation is data (their row of the operation-kind
// table) and a few rules (the side of an amount, the VAT account, which movements a
// line makes, what stands after the lines, what follows the piece), which each kind's
// class gives; each keeps its own name and its own branch table. A process handed an
// operation of another kind refuses it.
#pragma once

#include "host/decimal.h"
#include "host/table.h"
#include "model/traitmnt.h"
#include "registry/operation_kinds.h"

namespace posting {

using namespace host;

enum class Side { Debit, Credit };

// What the sales VAT of a line is owed on: receipts (CDTVA.CETVA) or debits (CDTVA.CITVA).
enum class VatBasis { Receipts, Debits };

class PostingProcess : public model::Traitmnt {
 public:
  // `e` carries the IDENT of the operation to post as parameter 0.
  PostingProcess(Evt* e, const registry::OperationKind& kind);

  void debut(Evt* e) override;
  void faire(Evt* e) override;
  void fait_import_piece(Evt* e);
  void creer_entete(Evt* e);
  void creer_ligne_ht(Evt* e);
  void creer_ligne_tva(Evt* e);
  void creer_ligne_tiers(Evt* e);
  void creer_echeance(Evt* e);
  void creer_analytique(Evt* e);
  void traiter_erreur(Evt* e);

 protected:
  const registry::OperationKind& kind_;

  // The kind's rules, asked again for each row and read on the header and the line
  // in the buffers:
  // where a positive HT or VAT of the current line goes (a negative one goes to the
  // other side, and the counterpart takes the opposite of both);
  virtual Side lineSide() = 0;
  // the VAT account of the current line, from its VAT code (CDTVA), the dossier
  // (PARAM) and the line's account (COMPT);
  virtual Valeur vatAccount() = 0;
  // the movements of the current line, read in MIRVAL; false when the import failed,
  // which ends the lines. By default: nothing for a zero HT, else the excluding-tax
  // movement and, when the line bears VAT, its VAT movement;
  virtual bool sendLine();
  // what stands after the lines; false when the import failed, which ends it. By
  // default the tiers movement on the header account with its due date;
  virtual bool sendCounterpart();
  // what follows the import of the piece, whatever its outcome. By default nothing.
  virtual void afterPiece() {}

  // Registers the branch table in its order. `counterpart` names the procedure that
  // writes the counterpart row, registered with the due-date row after it; nullptr
  // when the kind's piece has neither.
  void registerBranches(const char* counterpart);

  // Steps the kinds build their rules from.
  // Runs one of the automaton's own procedures.
  void procedure(const char* name);
  // Calls a procedure of the ledger's import component. On failure hands the code to
  // "TRAITER_ERREUR", raises V_FLAG_E and returns false.
  bool importer(const char* name, Evt* params = nullptr);
  // Reads an account into COMPT, or clears the buffer when there is none.
  void lireCompte(const Donnee& numcp);
  // The excluding-tax movement of the current line with its analytic rows; its
  // identifier goes into MIRVAL.MOUVE_UNIQ.
  bool sendExcludingTaxMovement();
  // The VAT movement of the current line on the account of its VAT code (vatAccount).
  bool sendVatOfCode();
  // A movement in the VAT form (line TVA on the line's side) on V_NUMCP.
  bool sendVatMovement();
  // The sales VAT account of the line's code: by the dossier's PMTVA, then by the line
  // account's TPTVA ("E" receipts, "D" debits), then by `otherwise`.
  Valeur salesVatAccount(VatBasis otherwise);

  // Variables.
  Chaine P_IDENT{"P_IDENT", "", "", 0, this};
  Entier V_FLAG_E{"V_FLAG_E", "", "", 0, this};
  Chaine V_INSTANCE{"V_INSTANCE", "", "", 0, this};
  Chaine V_NUMCP{"V_NUMCP", "", "", 0, this};
  Chaine V_NPIES{"V_NPIES", "", "", 0, this};
  Double V_MOUVE_UNIQ{"V_MOUVE_UNIQ", "", "", 0, this};

  // Tables; the main table MIRVAE is the automaton's own.
  Table PARAM{this, "", "PARAM", ""};
  Table MIRVAL{this, "", "MIRVAL", ""};
  Table COMPT{this, "", "COMPT", ""};
  Table MIRVAANA{this, "", "MIRVAANA", ""};
  Table MOUVE_IMM{this, "", "MOUVE_IMM", ""};
  Table CDTVA{this, "", "CDTVA", ""};
  Table ECHEA_IMM{this, "", "ECHEA_IMM", ""};
  Table PIECE_IMM{this, "", "PIECE_IMM", ""};
  Table VTSEC_IMM{this, "", "VTSEC_IMM", ""};

  // Fields.
  Champ MIRVAE_IDENT{this, "IDENT", table(false)};
  Champ MIRVAE_TYPE{this, "TYPE", table(false)};
  Champ MIRVAE_NPIES{this, "NPIES", table(false)};
  Champ MIRVAE_NUMCP{this, "NUMCP", table(false)};
  Champ MIRVAE_NUMJL{this, "NUMJL", table(false)};
  Champ MIRVAE_DTOPE{this, "DTOPE", table(false)};
  Champ MIRVAE_NPIEC{this, "NPIEC", table(false)};
  Champ MIRVAE_INPIE{this, "INPIE", table(false)};
  Champ MIRVAE_MONNAIE_IDENT{this, "MONNAIE_IDENT", table(false)};
  Champ MIRVAE_COURS{this, "COURS", table(false)};
  Champ MIRVAE_TTC{this, "TTC", table(false)};
  Champ MIRVAE_DTECH{this, "DTECH", table(false)};
  Champ MIRVAL_NUMERO{"NUMERO", &MIRVAL};
  Champ MIRVAL_IDENT{"IDENT", &MIRVAL};
  Champ MIRVAL_NUMCP{"NUMCP", &MIRVAL};
  Champ MIRVAL_HT{"HT", &MIRVAL};
  Champ MIRVAL_TVA{"TVA", &MIRVAL};
  Champ MIRVAL_COTVA{"COTVA", &MIRVAL};
  Champ MIRVAL_CPOST{"CPOST", &MIRVAL};
  Champ MIRVAL_CCRIT{"CCRIT", &MIRVAL};
  Champ MIRVAL_MOUVE_UNIQ{"MOUVE_UNIQ", &MIRVAL};
  Champ MIRVAANA_NUMERO{"NUMERO", &MIRVAANA};
  Champ MIRVAANA_CSECT{"CSECT", &MIRVAANA};
  Champ MIRVAANA_MTADE{"MTADE", &MIRVAANA};
  Champ MIRVAANA_MTACR{"MTACR", &MIRVAANA};
  Champ COMPT_NUMCP{"NUMCP", &COMPT};
  Champ COMPT_TPTVA{"TPTVA", &COMPT};
  Champ COMPT_CTYPR{"CTYPR", &COMPT};
  Champ COMPT_JLTRT{"JLTRT", &COMPT};
  Champ COMPT_CTYEC{"CTYEC", &COMPT};
  Champ COMPT_RGPAY{"RGPAY", &COMPT};
  Champ CDTVA_COTVA{"COTVA", &CDTVA};
  Champ CDTVA_CITVA{"CITVA", &CDTVA};
  Champ CDTVA_CETVA{"CETVA", &CDTVA};
  Champ CDTVA_DETVA{"DETVA", &CDTVA};
  Champ PARAM_PNUME{"PNUME", &PARAM};
  Champ PARAM_PMTVA{"PMTVA", &PARAM};
  Champ PIECE_IMM_NINST{"NINST", &PIECE_IMM};
  Champ PIECE_IMM_NUMJL{"NUMJL", &PIECE_IMM};
  Champ PIECE_IMM_DTOPE{"DTOPE", &PIECE_IMM};
  Champ PIECE_IMM_NSAIS{"NSAIS", &PIECE_IMM};
  Champ PIECE_IMM_NPIEC{"NPIEC", &PIECE_IMM};
  Champ PIECE_IMM_INPIE{"INPIE", &PIECE_IMM};
  Champ PIECE_IMM_MONNAIE_IDENT{"MONNAIE_IDENT", &PIECE_IMM};
  Champ PIECE_IMM_COURS{"COURS", &PIECE_IMM};
  Champ PIECE_IMM_CORIG{"CORIG", &PIECE_IMM};
  Champ MOUVE_IMM_NINST{"NINST", &MOUVE_IMM};
  Champ MOUVE_IMM_NUMCP{"NUMCP", &MOUVE_IMM};
  Champ MOUVE_IMM_LIBEC{"LIBEC", &MOUVE_IMM};
  Champ MOUVE_IMM_MTCRE{"MTCRE", &MOUVE_IMM};
  Champ MOUVE_IMM_MTDEB{"MTDEB", &MOUVE_IMM};
  Champ MOUVE_IMM_COTVA{"COTVA", &MOUVE_IMM};
  Champ MOUVE_IMM_CPOST{"CPOST", &MOUVE_IMM};
  Champ MOUVE_IMM_CCRIT{"CCRIT", &MOUVE_IMM};
  Champ ECHEA_IMM_NINST{"NINST", &ECHEA_IMM};
  Champ ECHEA_IMM_DTECH{"DTECH", &ECHEA_IMM};
  Champ ECHEA_IMM_CTYPR{"CTYPR", &ECHEA_IMM};
  Champ ECHEA_IMM_NJLTR{"NJLTR", &ECHEA_IMM};
  Champ ECHEA_IMM_CTYEC{"CTYEC", &ECHEA_IMM};
  Champ ECHEA_IMM_MTECH{"MTECH", &ECHEA_IMM};
  Champ ECHEA_IMM_BPECH{"BPECH", &ECHEA_IMM};
  Champ VTSEC_IMM_NINST{"NINST", &VTSEC_IMM};
  Champ VTSEC_IMM_CSECT{"CSECT", &VTSEC_IMM};
  Champ VTSEC_IMM_MTADE{"MTADE", &VTSEC_IMM};
  Champ VTSEC_IMM_MTACR{"MTACR", &VTSEC_IMM};

 private:
  void envoyerLignes();
  void envoyerAnalytique();
  // Starts a transfer row: reset for a new row, blank buffer, instance number.
  void nouvelleLigne(Table& table, Champ& ninst);
  // Removes this import's rows from a transfer table.
  void viderTransfert(Table& table, Champ& ninst);
  // Puts a signed amount into MOUVE_IMM: a positive one on `side`, a negative one
  // reversed on the other.
  void poser(const Decimal& amount, Side side);
};

}  // namespace posting
