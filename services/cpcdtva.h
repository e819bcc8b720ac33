// "CPCDTVA"/"INTERFACE": the VAT codes seen from the library.
//
//   "CHOIX" (code in/out, error out, VAT type)   the VAT code choice window over the
//       codes of that type (CDTVA.TYTVA; every code when the type is empty), in code
//       order. A pick is written into the first parameter with error "0"; a cancelled
//       window leaves the code unchanged with error "2". The method result is the
//       same number.
#pragma once

#include "host/automate.h"

namespace services {

class Cpcdtva : public host::Automate {
 public:
  explicit Cpcdtva(host::Evt* e);

  void choix(host::Evt* e);
};

}  // namespace services
