// "MIRVAE-GESTION6": the entry screen of miscellaneous operations. There is no header
// account: each line carries its own account and side, and the operation balances
// only if the user makes it balance, which is checked before it is saved.
#pragma once

#include <string>

#include "entry/parts.h"

namespace entry {

// The line account of a miscellaneous operation: any account of the chart, shown as
// VNUMCP, VLIBCP with its nature (VLIBNATUC) and the line's side (VLIBSENS_DC).
// A VAT account takes its amount typed as VAT.
class AnyAccount : public LineAccount {
 public:
  explicit AnyAccount(EntryScreen& screen);

  void started() override;
  void lineAccountRead() override;

  // Whether the account read is a VAT account.
  bool vatAccount() { return s_.COMPT_NATUC.chaine().find('T') != std::string::npos; }

  Chaine VNUMCP{"VNUMCP", "", "", 0, &s_};
  Chaine VLIBCP{"VLIBCP", "", "", 0, &s_};
  Chaine VLIBNATUC{"VLIBNATUC", "", "", 0, &s_};
  Chaine VLIBSENS_DC{"VLIBSENS_DC", "", "", 0, &s_};
  Champ COMPT_COTVA{"COTVA", &s_.COMPT};
  Champ COMPT_CPOST{"CPOST", &s_.COMPT};
  Champ COMPT_CCRIT{"CCRIT", &s_.COMPT};
};

// The totals of lines that carry a side: debit, credit and their difference. They
// are the movements the posting will write, so a piece that would not balance is
// refused before it is saved, with the amounts that differ.
class DebitCreditTotals : public Part {
 public:
  explicit DebitCreditTotals(EntryScreen& screen);

  void provide(Handlers& handlers) override;
  bool linesAccepted(Evt* e) override;
  void saving() override;

  void calcul_totaux(Evt* e);

  Monnaie V_TOT_DEB{"V_TOT_DEB", "", "", 0, &s_};
  Monnaie V_TOT_CRE{"V_TOT_CRE", "", "", 0, &s_};
  Monnaie V_SOLDE{"V_SOLDE", "", "", 0, &s_};

 private:
  // The debit and credit the posting will write for the lines, and their sums.
  struct Sums {
    Decimal debit, credit, ht, tva, ttc;
  };
  Sums sums();
};

}  // namespace entry

class MIRVAEGestion6 : public entry::EntryScreen {
 public:
  explicit MIRVAEGestion6(host::Evt* e);

  // Each line stands on its own side.
  bool lineOnDebit() override { return MIRVAL_SENS_DC == "D"; }
  // A debit of VAT is deductible, a credit is collected.
  std::string vatChoiceType() override { return MIRVAL_SENS_DC == "D" ? "A" : "V"; }
  // A model line gives its side, by which of its amounts it carries; the amount
  // itself is typed, as on every kind's model lines.
  void completeModelLine(host::Table& model) override;
  void selection(host::Evt* e) override;
  void debut_creation_ligne(host::Evt* e) override;
  void lst_mirval_tva(host::Evt* e) override;
  void validation_ligne(host::Evt* e) override;

  void lst_vlibsens_dc(host::Evt* e);
  void calcul_dc(host::Evt* e);

  host::Champ MIRVAL_SENS_DC{"SENS_DC", &MIRVAL};
  host::Champ MIRVAL_MTDEBS{"MTDEBS", &MIRVAL};
  host::Champ MIRVAL_MTCRES{"MTCRES", &MIRVAL};

 private:
  void provide(entry::Handlers& handlers) override;

  entry::EntryModels models_{*this, false};
  entry::AnyAccount lineAccount_{*this};
  entry::DebitCreditTotals totals_{*this};
  entry::StandardLabels labels_{*this};
  // The settlement rows of its lines are kept, replaced and deleted with the
  // operation, as on bank and cash operations.
  entry::JustificationRows justification_{*this};
};
