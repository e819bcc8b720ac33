#include "model/traitmnt.h"

namespace model {

Traitmnt::Traitmnt(Evt* e) : Traitbas(e) {
  addBaseBranch("DEBUT", [this](Evt* ev) { debut(ev); });
  addBaseBranch("FAIRE", [this](Evt* ev) { faire(ev); });
}

void Traitmnt::faire(Evt*) {}

void Traitmnt::demarrer() {
  executer("DEBUT", lancement());
  if (!estTermine()) executer("FAIRE", lancement());
  sortir(nullptr, 0);
}

}  // namespace model
