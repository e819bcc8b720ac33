#include "model/impetat.h"

namespace model {

Impetat::Impetat(Evt* e) : Traitmnt(e) {}
void Impetat::applyRequest(const std::string& sql) { request_ = sql; }
void Impetat::debut_fiche(Evt*) {}
void Impetat::demarrer() {}
void Impetat::printRecord() {}
std::string Impetat::describe(const std::string&, const std::string&) { return ""; }
void Edition_etat2::debut(Evt*) {}

}  // namespace model
