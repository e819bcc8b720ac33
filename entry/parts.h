// The parts of an entry screen that some kinds have and others not.
#pragma once

#include <string>

#include "entry/gestion.h"

namespace entry {

// The account of a line: typed by number into MIRVAL.NUMCP or by its label, chosen in
// a window, and read through a binding of the chart of accounts. Every kind has one;
// kinds name it differently and offer different accounts. The subclass makes the
// members and binds them.
class LineAccount : public Part {
 public:
  struct Members {
    Chaine* number;
    Chaine* label;
    Table* accounts;
    Champ *NUMCP, *LIBCP, *NATUC, *CCTRA, *COTVA, *CPOST, *CCRIT;
  };
  // `labelControl` is the list column of the label, `chooseBranch` the branch of the
  // choice window.
  LineAccount(EntryScreen& screen, const char* labelControl, const char* chooseBranch);

  void provide(Handlers& handlers) override;
  // Opens the selection of the accounts the lines may take, by number.
  void openSelection();

  const char* labelControl() const { return label_control_; }
  const char* chooseBranch() const { return choose_branch_; }
  Chaine& number() { return *m_.number; }
  Chaine& label() { return *m_.label; }
  Table& accounts() { return *m_.accounts; }
  Champ& NUMCP() { return *m_.NUMCP; }
  Champ& LIBCP() { return *m_.LIBCP; }
  Champ& NATUC() { return *m_.NATUC; }
  Champ& CCTRA() { return *m_.CCTRA; }
  Champ& COTVA() { return *m_.COTVA; }
  Champ& CPOST() { return *m_.CPOST; }
  Champ& CCRIT() { return *m_.CCRIT; }

 protected:
  void bind(const Members& members) { m_ = members; }

 private:
  const char* label_control_;
  const char* choose_branch_;
  Members m_{};
};

// The line account of invoices, expense notes, bank and cash operations: VNUMCP2,
// VLIBCP2, among the accounts of the kind's line nature (COMPT2).
class AccountOfNature : public LineAccount {
 public:
  explicit AccountOfNature(EntryScreen& screen);

  Chaine VNUMCP2{"VNUMCP2", "", "", 0, &s_};
  Chaine VLIBCP2{"VLIBCP2", "", "", 0, &s_};
  Table COMPT2{&s_, "", "COMPT", "COMPT2"};
  Champ COMPT2_NUMCP{"NUMCP", &COMPT2};
  Champ COMPT2_LIBCP{"LIBCP", &COMPT2};
  Champ COMPT2_NATUC{"NATUC", &COMPT2};
  Champ COMPT2_CCTRA{"CCTRA", &COMPT2};
  Champ COMPT2_COTVA{"COTVA", &COMPT2};
  Champ COMPT2_CPOST{"CPOST", &COMPT2};
  Champ COMPT2_CCRIT{"CCRIT", &COMPT2};
};

// The header account of invoices and expense notes: the counterparty typed by its
// label (VLIBCP1) into MIRVAE.NUMCP, chosen among the accounts of the kind's nature.
class HeaderAccount : public Part {
 public:
  explicit HeaderAccount(EntryScreen& screen);

  void provide(Handlers& handlers) override;
  void started() override;
  void opened() override;
  bool headerAccepted(Evt* e) override;
  bool chooses(const std::string& control) override;
  bool takesModelAccount(const std::string& account) override;

  virtual void vlibcp1(Evt* e);
  virtual void compt1_choisir(Evt* e);

  Chaine VNUMCP1{"VNUMCP1", "", "", 0, &s_};
  Chaine VLIBCP1{"VLIBCP1", "", "", 0, &s_};
  Table COMPT1{&s_, "", "COMPT", "COMPT1"};
  Champ COMPT1_NUMCP{"NUMCP", &COMPT1};
  Champ COMPT1_LIBCP{"LIBCP", &COMPT1};
  Champ COMPT1_NATUC{"NATUC", &COMPT1};
  Champ COMPT1_CCTRA{"CCTRA", &COMPT1};

 protected:
  // The nature letter the header account must have.
  virtual std::string nature() { return s_.kind().headerNature; }
};

// Entry models of the accounting application (MODTE, MODLI): a model chosen by its
// code on a new operation fills its piece number, label, header account and lines.
class EntryModels : public Part {
 public:
  // The branches of the part, in the order they are registered.
  static constexpr std::string_view kBranches[] = {"V_CMODEL", "V_CMODEL_CHOISIR", "MODTE_CHOISIR", "MODTE_GENERER"};

  // `offeredOnCreation`: whether a new operation opens with the model controls allowed.
  explicit EntryModels(EntryScreen& screen, bool offeredOnCreation = true);

  void provide(Handlers& handlers) override;
  void creationStarted() override;
  void creationShown() override;
  void modificationStarted() override;
  void choiceMade(const std::string& choice) override;

  void v_cmodel(Evt* e);
  void v_cmodel_choisir(Evt* e);
  void modte_choisir(Evt* e);
  void modte_generer(Evt* e);

  Chaine V_CMODEL{"V_CMODEL", "", "!(11)", 0, &s_};
  Table MODTE{&s_, "", "MODTE", ""};
  Table MODLI{&s_, "", "MODLI", ""};
  Champ MODTE_CODE{"CODE", &MODTE};
  Champ MODTE_NUMJL{"NUMJL", &MODTE};
  Champ MODTE_NPIEC{"NPIEC", &MODTE};
  Champ MODTE_INPIE{"INPIE", &MODTE};
  Champ MODLI_NLIGNE{"NLIGNE", &MODLI};
  Champ MODLI_COL_NUMCP{"COL_NUMCP", &MODLI};
  Champ MODLI_COL_LIBEC{"COL_LIBEC", &MODLI};
  Champ MODLI_COL_COTVA{"COL_COTVA", &MODLI};

 private:
  // Adds a line of the current model line on the account the line account part read.
  void addModelLine();

  bool offered_on_creation_;
};

// The form printed after saving, when the user chose "3Enregistrer et ~Imprimer".
class PrintAfterSaving : public Part {
 public:
  explicit PrintAfterSaving(EntryScreen& screen) : Part(screen) {}

  void provide(Handlers&) override {}
  void choiceMade(const std::string& choice) override { V_IMPR_FICHE = choice == "3" ? 1 : 0; }
  void saved() override;

  Entier V_IMPR_FICHE{"V_IMPR_FICHE", "", "", 0, &s_};
};

// The totals of lines that carry VAT: excluding tax, VAT and including tax, shown in
// "GRP_TOT" and saved into the header.
class VatTotals : public Part {
 public:
  explicit VatTotals(EntryScreen& screen);

  void provide(Handlers& handlers) override;
  bool linesAccepted(Evt* e) override;
  void saving() override;

  void calcul_totaux(Evt* e);

  Monnaie V_TOT_HT{"V_TOT_HT", "", "", 0, &s_};
  Monnaie V_TOT_TVA{"V_TOT_TVA", "", "", 0, &s_};
  Monnaie V_TOT_TTC{"V_TOT_TTC", "", "", 0, &s_};
};

// What bank, cash and miscellaneous operations share: the piece label chosen among
// the dossier's standard labels, and the last check of the lines' accounts before
// saving (an account left generic, gone from the chart, or closed to entries).
class StandardLabels : public Part {
 public:
  explicit StandardLabels(EntryScreen& screen);

  void provide(Handlers& handlers) override;
  bool chooses(const std::string& control) override;
  bool documentAccepted(Evt* e) override;

  void typlb_choisir(Evt* e);
  void tests_validation(Evt* e);

  Table TYPLB{&s_, "", "TYPLB", ""};
  Champ TYPLB_CTYLB{"CTYLB", &TYPLB};
  Champ TYPLB_ITYLB{"ITYLB", &TYPLB};
};

// The bank or cash account of bank and cash operations, with the journal that keeps
// it (JONAL.CPTRE), the operation's direction (TYPE_DR: "R" a receipt, "D" a
// payment) and the account's running balance.
//
// The balance shown is the account's as it will stand once this operation is saved:
// the ledger's over the exercise up to the closing date, less what the operation's
// own posted piece put on the account (it is replaced at saving), plus the operation
// as it now stands.
class TreasuryAccount : public HeaderAccount {
 public:
  explicit TreasuryAccount(EntryScreen& screen);

  void provide(Handlers& handlers) override;
  void started() override;
  void creationStarted() override;
  void opened() override;
  bool lineAccountAccepted(Evt* e, const std::string& account) override;
  void lineAccountRead() override;
  void linesTotalled(const Decimal& ttc) override;
  // The opening balance is shown in the document's currency.
  void amountsConverted(const std::string& line, const std::function<Decimal(const Decimal&)>& convert) override;

  void vlibcp1(Evt* e) override;
  void type_dr(Evt* e);
  void calcul_solde(Evt* e);
  void afficher_solde(Evt* e);

  bool payment() const { return MIRVAE_TYPE_DR == "D"; }
  // The nature letter a line account must have: with lines on expense and revenue
  // accounts (PRE19 "1"), a charge for a payment and a revenue for a receipt;
  // otherwise a supplier for a payment and a client for a receipt.
  std::string lineNature() const;
  // The message for a line without account, by the same choice.
  std::string lineAccountRequired() const;

  Chaine V_CPTRE{"V_CPTRE", "", "", 0, &s_};
  Chaine V_NUMCP_AVANT_MODIF{"V_NUMCP_AVANT_MODIF", "", "", 0, &s_};
  Chaine V_NUMJL{"V_NUMJL", "", "", 0, &s_};
  Chaine V_TSOLDE{"V_TSOLDE", "", "", 0, &s_};
  Chaine V_TYPE_DR{"V_TYPE_DR", "", "", 0, &s_};
  Monnaie V_SOLDE{"V_SOLDE", "", "", 0, &s_};
  Monnaie V_SOLDE_INITIAL{"V_SOLDE_INITIAL", "", "", 0, &s_};
  Monnaie V_TOT1_DR{"V_TOT1_DR", "", "", 0, &s_};
  Monnaie V_TOT2_DR{"V_TOT2_DR", "", "", 0, &s_};
  Champ JONAL_CPTRE{"CPTRE", &s_.JONAL};
  Champ MIRVAE_TYPE_DR{&s_, "TYPE_DR", s_.table(false)};
  Champ PARAM_PRE19{"PRE19", &s_.PARAM};
  Champ PARAM_PFO13{"PFO13", &s_.PARAM};

 private:
  // The treasury journal of the account in COMPT1 into V_NUMJL and V_CPTRE (both
  // empty when none keeps it); false when none does.
  bool readJournal();
};

// The due dates a line settles (MIRVAJUS), kept in the session's work table
// MIRVAJUS_M01 while the operation is entered and saved, read back and removed with
// it, line by line.
class JustificationRows : public Part {
 public:
  // The branches of the part, in the order they are registered.
  static constexpr std::string_view kBranches[] = {"EXTRACTION_TABLE_MIRVAJUS", "SUPPRESSION_TABLE_MIRVAJUS",
                                                   "VALIDATION_TABLE_MIRVAJUS"};

  explicit JustificationRows(EntryScreen& screen);

  void provide(Handlers& handlers) override;
  void lineExtracted() override;
  void lineSaved() override;
  void lineDeleted() override;
  // What a line settles is typed in the document's currency (MTREGS); the keeping
  // currency's amounts stay as they are.
  void amountsConverted(const std::string& line, const std::function<Decimal(const Decimal&)>& convert) override;

  void extraction_table_mirvajus(Evt* e);
  void suppression_table_mirvajus(Evt* e);
  void validation_table_mirvajus(Evt* e);
  // Drops the working rows of the current line.
  void discardWorkingRows();

  Table MIRVAJUS{&s_, "", "MIRVAJUS", ""};
  Table MIRVAJUS_M01{&s_, "", "MIRVAJUS_M01", ""};
  Champ MIRVAJUS_IDENTR{"IDENTR", &MIRVAJUS};
  Champ MIRVAJUS_M01_IDENTR{"IDENTR", &MIRVAJUS_M01};
  Champ MIRVAJUS_M01_MTREGS{"MTREGS", &MIRVAJUS_M01};
};

}  // namespace entry
