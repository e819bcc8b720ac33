// "SYSASCII"/"INTERFACE": text services.
//
//   "REMPLACER" (text in/out, text to find, replacement)   replaces in place every
//       occurrence of the text to find, left to right, never re-reading what was put
//       in; an empty text to find changes nothing.
#pragma once

#include "host/automate.h"

namespace services {

class Sysascii : public host::Automate {
 public:
  explicit Sysascii(host::Evt* e);

  void remplacer(host::Evt* e);
};

}  // namespace services
