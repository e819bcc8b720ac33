#include "model/traitecr.h"

#include "model/step.h"

namespace model {

Traitecr::Traitecr(Evt* e) : Traitbas(e) {
  addBaseBranch("INIT", [this](Evt* ev) { init(ev); });
  addBaseBranch("DEBUT", [this](Evt* ev) { debut(ev); });
  addBaseBranch("CTRL_DEBUT_MODIF", [this](Evt* ev) { ctrl_debut_modif(ev); });
}

void Traitecr::init(Evt*) {}
void Traitecr::ctrl_debut_modif(Evt*) {}

void Traitecr::demarrer() {
  if (step(*this, "INIT") == Outcome::accepted && step(*this, "DEBUT") == Outcome::accepted) return;
  // A start that was refused or failed shows nothing: the screen leaves.
  sortir(nullptr, 0);
}

}  // namespace model
