// Interface modules: procedures that other automata call by library and module
// name ("*", "MIRVAE", "INTERFACE", "IMPRESSION"). Interface2 : Interface.
//
// "IMPRESSION", references in this order: the print name ("fiche1" ... "fiche6",
// "liste1" ... "liste6") and the SQL text of the request. It runs the print job
// "<library>-IMPR_FICHE<n>" or "<library>-IMPR_LISTE<n>" of the interface's own
// library ("MIRVAE-IMPR_FICHE1" for "fiche1"), with the request as its main table's
// request, to its end. An unknown print name, or a job not registered, is a
// HostError naming it.
#pragma once

#include <string>

#include "host/automate.h"

namespace model {

using namespace host;

// The request of a form printing one record: "Select * From TABLE Where IDENT = '...'"
// with the identifier as an SQL literal (a quote in it doubled, so that it cannot end
// the literal).
std::string requeteFiche(const std::string& ident);

class Interface : public Automate {
 public:
  explicit Interface(Evt* e) : Automate(e) {}
};

class Interface2 : public Interface {
 public:
  explicit Interface2(Evt* e);

  // "IMPRESSION" (see above).
  virtual void impression(Evt* e);

  // Registry name of the print job for a print name; throws HostError when the
  // name is not "fiche<n>" or "liste<n>" with n from 1 to 6.
  std::string printJobFor(const std::string& printName) const;

 protected:
  // Directory alias of the interface ("[ZEFDEV]\COMPTA"), set by the module.
  std::string directoryAlias_;
};

}  // namespace model
