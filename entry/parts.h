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
  // The accounts the lines may take, by number.
  void started() override;

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

}  // namespace entry
