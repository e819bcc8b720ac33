// "ZEFMDS"/"NETTOYAGE_PARAMLST1_LISTE": clears the saved settings of a screen's
// list (parameter: the automaton's code + "-" + the list's name). The screens here
// keep no list settings between sessions, so there is nothing to clear: the module
// runs to its end and changes nothing.
#pragma once

#include "model/traitmnt.h"

namespace services {

class Nettoyage_paramlst1_liste : public model::Traitmnt {
 public:
  explicit Nettoyage_paramlst1_liste(host::Evt* e) : Traitmnt(e) {}
};

}  // namespace services
