// Processes without a screen (Traitmnt) and the common base of processes and
// screens (Traitbas).
//
// A process runs "DEBUT", then "FAIRE", then ends; a handler that leaves through
// sortir() stops the cycle where it is. Both steps are standard events: the
// process's own branch of that name replaces the base, which does nothing.
#pragma once

#include "host/automate.h"

namespace model {

using namespace host;

class Traitbas : public Automate {
 public:
  explicit Traitbas(Evt* e) : Automate(e) {}
};

class Traitmnt : public Traitbas {
 public:
  explicit Traitmnt(Evt* e);

  virtual void faire(Evt* e);
  void demarrer() override;
};

}  // namespace model
