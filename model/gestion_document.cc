#include "model/gestion_document.h"

#include "host/table.h"
#include "model/step.h"

namespace model {

Gestion_document::Gestion_document(Evt* e) : Sdocum(e) {
  addBaseBranch("INIT", [this](Evt* ev) { init(ev); });
}
void Gestion_document::init(Evt*) {}

Gestion_document2::Gestion_document2(Evt* e) : Gestion_document(e) {
  addBaseBranch("AVANT_DEBUT", [this](Evt* ev) { avant_debut(ev); });
  addBaseBranch("CTRL_CHOISIR", [this](Evt* ev) { ctrl_choisir(ev); });
  addBaseBranch("DEBUT_FICHE", [this](Evt* ev) { debut_fiche(ev); });
  addBaseBranch("CREAT2", [this](Evt* ev) { creation2(ev); });
}
void Gestion_document2::avant_debut(Evt*) {}
void Gestion_document2::ctrl_choisir(Evt*) {}
void Gestion_document2::ctrl_ouvre(Evt* e) { executer("CTRL_CHOISIR", e); }
void Gestion_document2::debut_fiche(Evt*) {}
void Gestion_document2::creation2(Evt* e) {
  std::string mode = modeCourant();
  if (!modePermis('C') || (mode != "M" && mode != "V")) {
    rejeter(e);
    return;
  }
  discardLineEntry();
  Table& header = *table(false);
  makeNew(header);
  header.affecter("IDENT", Valeur::texte(""));
  clearLines();
  // The copy keeps the header as the handler left it: no "DEBUT_CREATION".
  enterMode('C', false);
  if (step(*this, "DEBUT_FICHE") == Outcome::stopped) return;
  step(*this, "APRES_DEBUT_CREATION");
}

}  // namespace model
