#include "host/event.h"

#include "host/error.h"

namespace host {

Evt::~Evt() = default;

Donnee& Evt::parametre(int i) const {
  if (i < 0 || i >= nbParams())
    throw HostError("paramètre " + std::to_string(i) + " absent de l'événement « " + nom_ + " » (" +
                    std::to_string(nbParams()) + " paramètre(s))");
  return *params_[static_cast<std::size_t>(i)];
}

void Evt::param(int i, Donnee& variable, int mode) const {
  Donnee& source = parametre(i);
  if (mode == 1)
    variable.lier(source);
  else
    variable = source.valeur();
}

void Evt::ajouterCopie(const Donnee& d) { ajouterCopie(d.valeur()); }

void Evt::ajouterCopie(const Valeur& v) {
  auto copy = std::make_unique<Donnee>(v);
  params_.push_back(copy.get());
  owned_.push_back(std::move(copy));
}

void EvtParamRef::checkCount(int count) const {
  if (count != nbParams())
    throw HostError("EvtParamRef : " + std::to_string(count) + " paramètres annoncés, " +
                    std::to_string(nbParams()) + " donnés");
}

void EvtParamVal::checkCount(int count) const {
  if (count != nbParams())
    throw HostError("EvtParamVal : " + std::to_string(count) + " paramètres annoncés, " +
                    std::to_string(nbParams()) + " donnés");
}

}  // namespace host
