// "MIRVAE-GESTION1": the entry screen of client invoices.
#pragma once

#include "entry/gestion.h"

class MIRVAEGestion1 : public entry::EntryScreen {
 public:
  // `e` may carry the IDENT of the operation to open and the mode string.
  explicit MIRVAEGestion1(host::Evt* e);
};
