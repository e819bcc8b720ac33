#include "host/registry.h"

#include <cstdlib>

#include "host/automate.h"
#include "host/error.h"

namespace host {

namespace {
int refused_allocations = 0;
}

void* UniqueAlloc(std::size_t size) {
  if (refused_allocations > 0) {
    --refused_allocations;
    return nullptr;
  }
  return std::malloc(size);
}

void UniqueFree(void* memory) { std::free(memory); }

void refuserAllocations(int count) { refused_allocations = count; }

Global::Global(const char* name, const char* owner) {
  Registre::instance().ajouter({Declaration::kGlobal, name, "", owner ? owner : "", nullptr});
}

Source::Source(const char* name, const char* second) {
  Registre::instance().ajouter({Declaration::kSource, name, "", second ? second : "", nullptr});
}

Module::Module(const char* label, const char* name, Fabrique fabrique, bool, const char* extra) {
  Registre::instance().ajouter({Declaration::kModule, name, label ? label : "", extra ? extra : "", fabrique});
}

void DetruireAutomate::operator()(Automate* a) const {
  if (!a) return;
  a->~Automate();
  UniqueFree(a);
}

Registre& Registre::instance() {
  static Registre registre;
  return registre;
}

void Registre::ajouter(Declaration d) { declarations_.push_back(std::move(d)); }

std::vector<std::string> Registre::modules() const {
  std::vector<std::string> names;
  for (const auto& d : declarations_)
    if (d.sorte == Declaration::kModule) names.push_back(d.name);
  return names;
}

const Declaration* Registre::module(std::string_view name) const {
  for (const auto& d : declarations_)
    if (d.sorte == Declaration::kModule && d.name == name) return &d;
  return nullptr;
}

Fabrique Registre::substituer(std::string_view name, Fabrique fabrique) {
  for (auto& d : declarations_)
    if (d.sorte == Declaration::kModule && d.name == name) {
      Fabrique previous = d.fabrique;
      d.fabrique = fabrique;
      return previous;
    }
  throw HostError("module « " + std::string(name) + " » inconnu");
}

AutomatePtr Registre::creer(std::string_view name, Evt* lancement) const {
  const Declaration* d = module(name);
  if (!d) throw HostError("module « " + std::string(name) + " » inconnu");
  Automate* a = const_cast<Automate*>(d->fabrique(lancement));
  if (!a) throw HostError("mémoire insuffisante pour créer le module « " + std::string(name) + " »");
  a->setCode(std::string(name));
  return AutomatePtr(a);
}

std::string Registre::nomModule(std::string_view base, std::string_view source, std::string_view module) {
  std::string library(source == "$$" ? base : source);
  if (library.empty()) return std::string(module);
  return library + "-" + std::string(module);
}

}  // namespace host
