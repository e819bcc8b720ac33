// "MIRVAE-GESTION2": the entry screen of supplier invoices. It has the parts and the
// branches of a client invoice; its lines stand on the debit, and a line account may
// be a charge or a fixed asset.
#pragma once

#include "entry/parts.h"

class MIRVAEGestion2 : public entry::EntryScreen {
 public:
  explicit MIRVAEGestion2(host::Evt* e);

  // Charges stand on the debit.
  bool lineOnDebit() override { return true; }
  // The account passes when it has any one of the nature letters; a charge account
  // ("H") may also be a fixed asset ("M").
  void controler_compt(host::Evt* e) override;

 private:
  entry::EntryModels models_{*this};
  entry::HeaderAccount header_{*this};
  entry::AccountOfNature lineAccount_{*this};
  entry::VatTotals totals_{*this};
  entry::PrintAfterSaving print_{*this};
};
