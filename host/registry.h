// The module registry: what a loaded library declares, and how the host finds a
// module by its name and builds it.
//
// Declarations are recorded in the order they are made. A library registers its
// units from one function called at load time (never from static initialisers,
// whose order across files is not defined), so the order is the load order.
#pragma once

#include <cstddef>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

namespace host {

class Automate;
class Evt;

using Fabrique = Automate const* (*)(Evt*);

// The host allocator of automata. UniqueAlloc returns null when memory is refused.
void* UniqueAlloc(std::size_t size);
void UniqueFree(void* memory);
// Tests: the next `count` allocations fail.
void refuserAllocations(int count);

struct Declaration {
  enum Sorte { kGlobal, kModule, kSource, kVariable } sorte;
  std::string name, label, second;
  Fabrique fabrique = nullptr;
};

// Load-time declarations; each records itself in the registry.
class Global {
 public:
  Global(const char* name, const char* owner);
};
class Source {
 public:
  Source(const char* name, const char* second);
};
class Module {
 public:
  Module(const char* label, const char* name, Fabrique fabrique, bool flag, const char* extra);
};

// Destroys an automaton built by a factory: virtual destructor, then UniqueFree.
struct DetruireAutomate {
  void operator()(Automate* a) const;
};
using AutomatePtr = std::unique_ptr<Automate, DetruireAutomate>;

class Registre {
 public:
  static Registre& instance();

  void ajouter(Declaration d);
  const std::vector<Declaration>& declarations() const { return declarations_; }
  std::vector<std::string> modules() const;  // module names in load order
  const Declaration* module(std::string_view name) const;

  // Builds the module registered as `name` with the launch event. Throws HostError
  // for an unknown name or a factory that returned null; a constructor's exception
  // passes through.
  AutomatePtr creer(std::string_view name, Evt* lancement) const;

  // Registry name of a module called as (base, library, module): ("", "MIRVAE",
  // "GESTION1") is "MIRVAE-GESTION1"; a library "$$" stands for the base's own.
  static std::string nomModule(std::string_view base, std::string_view source, std::string_view module);

  // Puts another factory behind a registered name and returns the one it had
  // (tests stand a double in for a module, then put the real one back).
  Fabrique substituer(std::string_view name, Fabrique fabrique);

 private:
  std::vector<Declaration> declarations_;
};

// The factory of every class: allocate through UniqueAlloc, build with the event.
template <class T>
Automate const* fabriquer(Evt* e) {
  void* memory = UniqueAlloc(sizeof(T));
  if (!memory) return nullptr;
  try {
    return new (memory) T(e);
  } catch (...) {
    UniqueFree(memory);
    throw;
  }
}

}  // namespace host
