// "CPCOMPT"/"INTERFACE": the chart of accounts seen from the library.
//
//   "CHOIX_INTITULE_REDUIT" (value in/out, start, nature letters, column, "N")
//       the account choice window. It offers the accounts whose NATUC holds one of
//       the nature letters (any account when there are none) and that are not left
//       out of the lists (CCTRA "O"), by the column "NUMCP" or "LIBCP", in that
//       column's order. `start` is either the field the caller shows (not read) or
//       a pattern ending with "*" ("421*": numbers beginning with 421, whichever
//       column is shown); without one, a value ending with "*" (typed "70*") keeps
//       the values of the column that begin with it. The pick, in the chosen
//       column, is written into the first parameter; a cancelled
//       window leaves it unchanged and sets the method result to 1. The last
//       parameter is accepted and not read.
//   "LECTURE" (account number)   reads the account into the interface table
//       I_CPCOMPT; an unknown account leaves a blank record there and sets the
//       method result to 1.
#pragma once

#include "host/automate.h"

namespace services {

class Cpcompt : public host::Automate {
 public:
  explicit Cpcompt(host::Evt* e);

  void choix_intitule_reduit(host::Evt* e);
  void lecture(host::Evt* e);
};

}  // namespace services
