#include "model/impression.h"

#include "host/error.h"

namespace model {

Imprimante& Imprimante::courante() {
  thread_local Imprimante printer;
  return printer;
}

void Imprimante::commencer(std::string module, std::string requete) {
  printed_.push_back({std::move(module), std::move(requete), {}});
}

void Imprimante::ecrire(std::string ligne) {
  if (printed_.empty()) throw host::HostError("aucune impression commencée");
  printed_.back().lignes.push_back(std::move(ligne));
}

const Impression& Imprimante::derniere() const {
  if (printed_.empty()) throw host::HostError("aucune impression n'a été faite");
  return printed_.back();
}

}  // namespace model
