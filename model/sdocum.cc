#include "model/sdocum.h"

#include "host/error.h"
#include "model/step.h"

namespace model {

Sdocum::Sdocum(Evt* e) : Setape(e) {}
Sdocum::~Sdocum() = default;

void Sdocum::configureDocument(const char*, const char*, const char*) {}
void Sdocum::controler(const char* name) { refused_control_ = name ? name : ""; }
void Sdocum::dialogue(Evt*) {}
void Sdocum::apres_validation(Evt*) {}
void Sdocum::apres_debut_creation(Evt*) {}
void Sdocum::apres_abandon(Evt*) {}
void Sdocum::ctrl_debut_ligne(Evt*) {}
void Sdocum::debut_creation_ligne(Evt*) {}
void Sdocum::validation_ligne(Evt*) {}
void Sdocum::apres_validation_ligne(Evt*) {}
void Sdocum::apres_suppression_ligne(Evt*) {}
void Sdocum::apres_abandon_ligne(Evt*) {}
void Sdocum::extraction_donnees(Evt*) {}
void Sdocum::validation_donnees(Evt*) {}
void Sdocum::suppression_donnees(Evt*) {}
void Sdocum::selection(Evt*) {}
void Sdocum::ctrl_cache_colonne(Evt*) {}
void Sdocum::ctrl_custom_colonne(Evt*) {}
void Sdocum::ctrl_debut_modif_liste(Evt*) {}
void Sdocum::ajouter_ligne(Evt*) {}
void Sdocum::renumerote_lignes(Evt*) {}
bool Sdocum::enterList() { return false; }
bool Sdocum::newLine() { return false; }
bool Sdocum::goToLine(int) { return false; }
bool Sdocum::validateLine() { return false; }
bool Sdocum::deleteLine() { return false; }
bool Sdocum::abandonLine() { return false; }
bool Sdocum::beginLineChange() { return false; }
std::vector<RowText> Sdocum::rows() { return {}; }
int Sdocum::currentLine() { return 0; }
bool Sdocum::closeLineEntry() { return true; }
void Sdocum::loadLines(bool) {}
void Sdocum::clearLines() {}
void Sdocum::saveLines(const std::string&) {}
void Sdocum::deleteLines(const std::string&) {}

}  // namespace model
