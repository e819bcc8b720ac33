#include "entry/gestion1.h"

MIRVAEGestion1::MIRVAEGestion1(host::Evt* e) : EntryScreen(e, registry::operationKind(1)) {
  registerBranches(entry::kInvoiceBranches);
}
