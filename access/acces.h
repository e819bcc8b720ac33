// The access screens: the operations of one kind for a period, filtered by posting
// state and piece number (and, for most kinds, by account), with the actions that
// open the entry screen, print, and show the ledger piece.
//
// MIRVAEAcces holds what every kind shares; a kind's screen passes its row of the
// operation-kind table and adds its account part: one client or supplier account
// (kinds 1 and 2), a staff or a supplier account (kind 3), one bank or cash account
// with its balance (kinds 4 and 5), none (kind 6).
#pragma once

#include <functional>

#include "host/table.h"
#include "model/acces.h"
#include "registry/operation_kinds.h"

namespace browser {

class MIRVAEAcces : public model::Acces2 {
 public:
  void init(host::Evt* e) override;
  void debut_activation(host::Evt* e) override;
  void active_requete(host::Evt* e) override;
  void avant_debut(host::Evt* e) override;
  void debut(host::Evt* e) override;
  void vmoian_selection(host::Evt* e);
  void vmoian(host::Evt* e);
  void vmoian_ferme(host::Evt* e);
  void calculer_dates(host::Evt* e);
  void vdate_debut(host::Evt* e);
  void vdate_fin(host::Evt* e);
  void vimput(host::Evt* e);
  void vnpiec_tous(host::Evt* e);
  void vnpiec(host::Evt* e);
  void lst_liste_vide(host::Evt* e);
  void lst_liste_pleine(host::Evt* e);
  void lst_selection(host::Evt* e);
  void gerer(host::Evt* e) override;
  void modifier(host::Evt* e) override;
  void creer(host::Evt* e) override;
  void impr_fiche(host::Evt* e) override;
  void impr_liste(host::Evt* e) override;
  void controler_dossier(host::Evt* e);
  void visu_piece(host::Evt* e);

  const registry::OperationKind& kind() const { return kind_; }

 protected:
  MIRVAEAcces(host::Evt* e, const registry::OperationKind& kind);

  // Registers the branch table in its order; `accountBranches` adds the kind's own
  // branches, which stand between the posting-state filter and the piece filter.
  void registerBranches(const std::function<void()>& accountBranches);

  // The kind's account part of the shared steps. Each does nothing for a kind
  // without an account.
  // DEBUT, once the period is set: the account filters' starting state.
  virtual void openAccounts() {}
  // ACTIVE_REQUETE, after the date filters and before the piece number.
  virtual void filterOnAccounts(host::Table& main) {}
  // LST_SELECTION, for a row that passed the posting-state filter; may reject it.
  virtual void describeRow(host::Evt* e) {}
  // The screen group that holds the piece filter.
  virtual const char* pieceGroup() const { return "P2"; }

  // "MESS_OK" of the message module.
  void messageOk(const std::string& text);
  void requery() { appelerProcedure("", "", "", "ACTIVE_REQUETE", nullptr, 0); }
  // Shows `message`, puts the focus back on `control` and refuses the input.
  void refuseInput(host::Evt* e, const std::string& message, const char* control);
  // The title of the row's account read through `accounts`, or the kind's text for
  // an account that is gone.
  std::string rowAccountTitle(host::Table& accounts, host::Champ& number, host::Champ& title);

  const registry::OperationKind& kind_;

  // Variables
  host::Chaine VMOIAN{"VMOIAN", "", "", 0, this};
  host::Chaine MOANO_CHEV{"MOANO_CHEV", "Période de chevauchement O/N pour combo Mois/Année", "", 0, this};
  host::Date VDATE_DEBUT{"VDATE_DEBUT", "", "", 0, this};
  host::Date VDATE_FIN{"VDATE_FIN", "", "", 0, this};
  host::Date VDATE_MIN{"VDATE_MIN", "", "", 0, this};
  host::Date VDATE_MAX{"VDATE_MAX", "", "", 0, this};
  host::Chaine VIMPUT{"VIMPUT", "", "", 0, this};
  host::Chaine VNPIEC_TOUS{"VNPIEC_TOUS", "", "", 0, this};
  host::Chaine VNPIEC{"VNPIEC", "", "", 0, this};
  host::Chaine VETAT{"VETAT", "", "", 0, this};
  host::Chaine VIDENT{"VIDENT", "", "", 0, this};
  host::Date DATE_CLOTURE{"DATE_CLOTURE", "Date de clôture", "8", 0, this};
  host::Date DATE_DEBUT_NOUVEL_E{"DATE_DEBUT_NOUVEL_E", "Date de début du nouvel exercice", "8", 0, this};

  // Tables
  host::Table PARAM{this, "", "PARAM", ""};
  host::Table MEM04{this, "", "MEM04", ""};
  host::Table MEM02{this, "", "MEM02", ""};
  host::Table PIECE{this, "", "PIECE", ""};

  // Fields of the main table
  host::Champ TYPE{this, "TYPE", table(false)};
  host::Champ DTOPE{this, "DTOPE", table(false)};
  host::Champ NUMCP{this, "NUMCP", table(false)};
  host::Champ NPIEC{this, "NPIEC", table(false)};
  host::Champ NPIES{this, "NPIES", table(false)};
  host::Champ IDENT{this, "IDENT", table(false)};
  // PARAM
  host::Champ PARAM_PNUME{"PNUME", &PARAM};
  host::Champ PARAM_PRE18{"PRE18", &PARAM};
  host::Champ PARAM_PDTCL{"PDTCL", &PARAM};
  host::Champ PARAM_PDFEX{"PDFEX", &PARAM};
  host::Champ PARAM_PDDEX{"PDDEX", &PARAM};
  host::Champ PARAM_PXCLO{"PXCLO", &PARAM};
  // MEM02, MEM04
  host::Champ MEM02_ANMOI{"ANMOI", &MEM02};
  host::Champ MEM04_ANMOI{"ANMOI", &MEM04};
  host::Champ MEM04_EXERCICE{"EXERCICE", &MEM04};
  host::Champ MEM04_MOIAN{"MOIAN", &MEM04};
  // PIECE
  host::Champ PIECE_NPIES{"NPIES", &PIECE};
  host::Champ PIECE_IMPUT{"IMPUT", &PIECE};

 private:
  // Leaves the screen at once, without pending messages.
  void quitter(host::Evt* e);
  // The YYYYMM of DATE_DEBUT_NOUVEL_E.
  std::string anneeMoisNouvelExercice();
  void verifierBorne(host::Evt* e, host::Date& date, const char* start, const char* control);
  void ouvrirGestion(const char* mode);
};

// Kinds 1 and 2: every account of the kind's nature, or one chosen by its title.
class CounterpartyBrowser : public MIRVAEAcces {
 public:
  void vnumcp_tous(host::Evt* e);
  void vlibcp1(host::Evt* e);
  void compt1_choisir(host::Evt* e);

 protected:
  CounterpartyBrowser(host::Evt* e, const registry::OperationKind& kind);
  void openAccounts() override;
  void filterOnAccounts(host::Table& main) override;
  void describeRow(host::Evt* e) override;

  host::Chaine VNUMCP_TOUS{"VNUMCP_TOUS", "", "", 0, this};
  host::Chaine VNUMCP1{"VNUMCP1", "", "", 0, this};
  host::Chaine VLIBCP1{"VLIBCP1", "", "", 0, this};
  host::Chaine VLIBCP2{"VLIBCP2", "", "", 0, this};

  host::Table COMPT1{this, "", "COMPT", "COMPT1"};
  host::Table COMPT2{this, "", "COMPT", "COMPT2"};

  host::Champ COMPT1_NATUC{"NATUC", &COMPT1};
  host::Champ COMPT1_CCTRA{"CCTRA", &COMPT1};
  host::Champ COMPT1_LIBCP{"LIBCP", &COMPT1};
  host::Champ COMPT1_NUMCP{"NUMCP", &COMPT1};
  host::Champ COMPT2_NUMCP{"NUMCP", &COMPT2};
  host::Champ COMPT2_LIBCP{"LIBCP", &COMPT2};
};

class MIRVAEAcces1 : public CounterpartyBrowser {
 public:
  explicit MIRVAEAcces1(host::Evt* e) : CounterpartyBrowser(e, registry::operationKind(1)) {}
};

class MIRVAEAcces2 : public CounterpartyBrowser {
 public:
  explicit MIRVAEAcces2(host::Evt* e) : CounterpartyBrowser(e, registry::operationKind(2)) {}
};

// Kind 3: an expense note is owed to a staff member or to a supplier; the list is
// filtered on one of the two accounts at most (VNUMCP_TOUS "T" all, "P" a staff
// account, "F" a supplier account).
class MIRVAEAcces3 : public MIRVAEAcces {
 public:
  explicit MIRVAEAcces3(host::Evt* e);

  void vnumcp_tous(host::Evt* e);
  void vlibcp1p(host::Evt* e);
  void compt1p_choisir(host::Evt* e);
  void vlibcp1f(host::Evt* e);
  void compt1f_choisir(host::Evt* e);

 protected:
  void openAccounts() override;
  void filterOnAccounts(host::Table& main) override;
  void describeRow(host::Evt* e) override;

  host::Chaine VNUMCP_TOUS{"VNUMCP_TOUS", "", "", 0, this};
  host::Chaine VNUMCP1P{"VNUMCP1P", "", "", 0, this};
  host::Chaine VLIBCP1P{"VLIBCP1P", "", "", 0, this};
  host::Chaine VNUMCP1F{"VNUMCP1F", "", "", 0, this};
  host::Chaine VLIBCP1F{"VLIBCP1F", "", "", 0, this};
  host::Chaine VLIBCP2{"VLIBCP2", "", "", 0, this};

  host::Table COMPT1P{this, "", "COMPT", "COMPT1P"};
  host::Table COMPT1F{this, "", "COMPT", "COMPT1F"};
  host::Table COMPT2{this, "", "COMPT", "COMPT2"};

  host::Champ COMPT1P_NUMCP{"NUMCP", &COMPT1P};
  host::Champ COMPT1P_NATUC{"NATUC", &COMPT1P};
  host::Champ COMPT1P_CCTRA{"CCTRA", &COMPT1P};
  host::Champ COMPT1P_LIBCP{"LIBCP", &COMPT1P};
  host::Champ COMPT1F_NUMCP{"NUMCP", &COMPT1F};
  host::Champ COMPT1F_NATUC{"NATUC", &COMPT1F};
  host::Champ COMPT1F_CCTRA{"CCTRA", &COMPT1F};
  host::Champ COMPT1F_LIBCP{"LIBCP", &COMPT1F};
  host::Champ COMPT2_NUMCP{"NUMCP", &COMPT2};
  host::Champ COMPT2_LIBCP{"LIBCP", &COMPT2};

 private:
  // One of the two accounts a note may be filtered on, with what names it.
  struct Side {
    host::Chaine& number;
    host::Chaine& title;
    host::Table& accounts;
    host::Champ& accountNumber;
    host::Champ& accountTitle;
    const char* filter;   // VNUMCP_TOUS once an account of this side is chosen
    const char* missing;  // when no account has the title typed
    const char* control;
  };
  Side staff();
  Side supplier();
  // The title typed on `side`: that account alone is kept and the other side is
  // forgotten, or every account when the title is empty.
  void choose(host::Evt* e, const Side& side, const Side& other);
};

// Kinds 4 and 5: the operations of one bank (cash) account, opened on the first one
// with its balance, filtered by direction; a payment's amounts are shown negated.
class TreasuryBrowser : public MIRVAEAcces {
 public:
  void debut_activation(host::Evt* e) override;
  void vtype_dr(host::Evt* e);
  void vlibcp1(host::Evt* e);
  void compt1_choisir(host::Evt* e);
  void calcul_solde(host::Evt* e);

 protected:
  TreasuryBrowser(host::Evt* e, const registry::OperationKind& kind);
  void openAccounts() override;
  void filterOnAccounts(host::Table& main) override;
  void describeRow(host::Evt* e) override;

  host::Chaine VTYPE_DR{"VTYPE_DR", "", "", 0, this};
  host::Chaine VNUMCP1{"VNUMCP1", "", "", 0, this};
  host::Chaine VLIBCP1{"VLIBCP1", "", "", 0, this};
  host::Monnaie V_SOLDE{"V_SOLDE", "", "", 0, this};
  host::Chaine V_TSOLDE{"V_TSOLDE", "", "", 0, this};
  host::Monnaie V_TTC{"V_TTC", "", "", 0, this};
  host::Monnaie V_TVA{"V_TVA", "", "", 0, this};
  host::Monnaie V_HT{"V_HT", "", "", 0, this};

  host::Table COMPT1{this, "", "COMPT", "COMPT1"};

  host::Champ TYPE_DR{this, "TYPE_DR", table(false)};
  host::Champ TTC{this, "TTC", table(false)};
  host::Champ TVA{this, "TVA", table(false)};
  host::Champ HT{this, "HT", table(false)};
  host::Champ PARAM_MONNAIE_IDENT{"MONNAIE_IDENT", &PARAM};
  host::Champ COMPT1_NATUC{"NATUC", &COMPT1};
  host::Champ COMPT1_CCTRA{"CCTRA", &COMPT1};
  host::Champ COMPT1_LIBCP{"LIBCP", &COMPT1};
  host::Champ COMPT1_NUMCP{"NUMCP", &COMPT1};
};

class MIRVAEAcces4 : public TreasuryBrowser {
 public:
  explicit MIRVAEAcces4(host::Evt* e) : TreasuryBrowser(e, registry::operationKind(4)) {}
};

class MIRVAEAcces5 : public TreasuryBrowser {
 public:
  explicit MIRVAEAcces5(host::Evt* e) : TreasuryBrowser(e, registry::operationKind(5)) {}
};

// Kind 6: a miscellaneous operation has no header account.
class MIRVAEAcces6 : public MIRVAEAcces {
 public:
  explicit MIRVAEAcces6(host::Evt* e);

 protected:
  const char* pieceGroup() const override { return "P1"; }
};

}  // namespace browser
