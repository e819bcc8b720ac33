// "CPPARAM"/"INTERFACE": the dossier parameters seen from the library.
//
//   "LECTURE" ()               checks that the dossier has its parameters row (PARAM,
//       PNUME 1); when it has none, tells the user and sets the method result to 1.
//   "INFO_FICHE" (text)        shows the record information text, its CR LF line
//       breaks kept as line breaks.
#pragma once

#include "host/automate.h"

namespace services {

class Cpparam : public host::Automate {
 public:
  explicit Cpparam(host::Evt* e);

  void lecture(host::Evt* e);
  void info_fiche(host::Evt* e);
};

}  // namespace services
