#include "model/saisie.h"

#include "host/error.h"
#include "host/table.h"
#include "model/step.h"

namespace model {

AutomTab::AutomTab(Evt* e) : Automate(e) {}

void AutomTab::planTri(const char* plan, const char* index) {
  sort_plan_ = plan ? plan : "";
  sort_index_ = index ? index : "";
}

Saisie::Saisie(Evt* e) : AutomTab(e) {}

void Saisie::modeSaisie(std::string_view) {}
bool Saisie::modePermis(char) const { return true; }
void Saisie::avant_suppression(Evt*) { deletion_allowed_ = true; }
void Saisie::debut_visualisation(Evt*) {}
void Saisie::debut_modification(Evt*) {}
void Saisie::debut_creation(Evt*) {}
void Saisie::fin_creation(Evt*) {}
void Saisie::validation(Evt*) {}
void Saisie::ctrl_ouvre(Evt*) {}
void Saisie::ctrl_actualiser_mode(Evt*) {}
void Saisie::creation(Evt*) {}
void Saisie::suppression(Evt*) {}
void Saisie::demarrer() {}
std::string Saisie::identifiantDocument() { return ""; }
void Saisie::enterMode(char m) { mode_ = m; }
bool Saisie::openDocument(const std::string&) { return false; }
void Saisie::applyVisuRequest() {}

Setape::Setape(Evt* e) : Saisie(e) {}
void Setape::modification(Evt*) {}
void Setape::valid_doc(Evt*) {}
void Setape::aband_doc(Evt*) {}

}  // namespace model
