// "ZEFNDOC"/"INTERFACE": document numbers, the identifiers of the rows the library
// writes (lines, analytic rows, due dates).
//
//   "ATTRIBUE_NUMERO" (base, counter table, name, "", width, identifier out)
//       reserves the next number of the counter `name` ("MIRVAL", "MIRVAANA"...) of
//       the table NDOC of the base "CP", and writes it into the last parameter as
//       `width` digits ("00000042"), above every identifier of that width already in
//       the table of that name. A number that no longer fits the width is a
//       HostError: a wider identifier would break the key order of the rows.
//   "VALIDE_NUMERO" (the same parameters)   confirms the identifier: it must be one
//       that the counter has handed out, else HostError.
//
// A number is drawn inside the unit of work under way, which holds the dossier's
// write lock, so two processes working on one dossier never receive the same one;
// an action that is undone gives its numbers back with everything else it wrote.
#pragma once

#include "host/automate.h"

namespace services {

class Zefndoc : public host::Automate {
 public:
  explicit Zefndoc(host::Evt* e);

  void attribue_numero(host::Evt* e);
  void valide_numero(host::Evt* e);
};

}  // namespace services
