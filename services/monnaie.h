// "MONNAIE"/"INTERFACE": the dossier's currencies seen from the library. The
// amounts and rates themselves are the currency service's (host/currency.h).
//
//   "LECTURE" (currency code)   reads the currency into the interface table
//       I_MONNAIE. An unknown or empty code is a HostError naming it. The currency
//       service's current currency is not changed: only the currency switch does that.
//   "CHOIX" (currency code in/out)   the currency choice window, in code order. A pick
//       is written into the parameter and read into I_MONNAIE, method result 0; a
//       cancelled window leaves both unchanged, method result 2.
#pragma once

#include "host/automate.h"

namespace services {

class Monnaie : public host::Automate {
 public:
  explicit Monnaie(host::Evt* e);

  void lecture(host::Evt* e);
  void choix(host::Evt* e);
};

}  // namespace services
