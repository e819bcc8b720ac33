// "MIRVAE-GESTION4" and "MIRVAE-GESTION5": the entry screens of bank and cash
// operations, alike but for their row of the kind table. The header is the bank or
// cash account and the direction of the operation: a receipt's lines stand on the
// credit and the account is debited, a payment's the other way. The lines take
// accounts by that direction, typed in full; the account's balance follows the lines;
// the due dates a line settles are kept with it.
#pragma once

#include <string>

#include "entry/parts.h"

namespace entry {

class TreasuryEntry : public EntryScreen {
 public:
  TreasuryEntry(Evt* e, int kind);

  bool lineOnDebit() override { return account_.payment(); }
  std::string lineNature() override { return account_.lineNature(); }
  std::string vatChoiceType() override { return account_.payment() ? "A" : "V"; }
  // The natures of the line accounts follow each operation's direction.
  void openLineSelections() override {}

  void ctrl_debut_ligne(Evt* e) override;
  void debut_creation_ligne(Evt* e) override;
  void validation_ligne(Evt* e) override;
  void apres_validation_ligne(Evt* e) override;

  void bt_justif(Evt* e);
  void appel_justification(Evt* e);

 private:
  void provide(Handlers& handlers) override;

  EntryModels models_{*this};
  TreasuryAccount account_{*this};
  AccountOfNature lineAccount_{*this};
  VatTotals totals_{*this};
  StandardLabels labels_{*this};
  JustificationRows justification_{*this};
};

}  // namespace entry

class MIRVAEGestion4 : public entry::TreasuryEntry {
 public:
  // `e` may carry the IDENT of the operation to open and the mode string.
  explicit MIRVAEGestion4(host::Evt* e) : TreasuryEntry(e, 4) {}
};

class MIRVAEGestion5 : public entry::TreasuryEntry {
 public:
  // `e` may carry the IDENT of the operation to open and the mode string.
  explicit MIRVAEGestion5(host::Evt* e) : TreasuryEntry(e, 5) {}
};
