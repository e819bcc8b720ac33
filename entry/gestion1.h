// "MIRVAE-GESTION1": the entry screen of client invoices.
#pragma once

#include "entry/parts.h"

class MIRVAEGestion1 : public entry::EntryScreen {
 public:
  // `e` may carry the IDENT of the operation to open and the mode string.
  explicit MIRVAEGestion1(host::Evt* e);

  // Revenue stands on the credit.
  bool lineOnDebit() override { return false; }

 private:
  entry::EntryModels models_{*this};
  entry::HeaderAccount header_{*this};
  entry::AccountOfNature lineAccount_{*this};
  entry::VatTotals totals_{*this};
  entry::PrintAfterSaving print_{*this};
};
