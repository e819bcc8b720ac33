// Events handed to handlers, with their parameters.
//
// An EvtParamRef carries the caller's own variables: a callee that binds a
// parameter (param(i, var, 1)) reads and writes the caller's variable, which must
// live until the callee has returned. An EvtParamVal carries copies made when the
// event is built, so it may outlive the caller's variables (lancerModule keeps it).
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "host/value.h"

namespace host {

class HostError;

// The code block of an empty event; its numbers are kept, not read.
struct InfoCode {
  InfoCode(int a, int b, int c, int d, int e, int f) : codes{a, b, c, d, e, f} {}
  int codes[6];
};

class Evt {
 public:
  Evt() = default;
  Evt(const Evt&) = delete;
  Evt& operator=(const Evt&) = delete;
  virtual ~Evt();

  // Name of the event being handled; set by the host when it dispatches.
  const std::string& nom() const { return nom_; }
  void setNom(std::string nom) { nom_ = std::move(nom); }

  int nbParams() const { return static_cast<int>(params_.size()); }
  // Parameter i (from 0): mode 0 copies its value into `variable`, mode 1 binds
  // `variable` to it. Throws HostError naming the event when i is out of range.
  void param(int i, Donnee& variable, int mode) const;
  // The parameter itself.
  Donnee& parametre(int i) const;

  // The host error attached to this event by a handler's trap.
  HostError* adresseC = nullptr;

  // Refusal of the event by its handler (Automate::rejeter).
  bool rejete() const { return rejected_; }
  void setRejete(bool rejected) { rejected_ = rejected; }

  // Appends parameters; literals given as text become owned Chaine.
  void ajouterReference(Donnee& d) { params_.push_back(&d); }
  void ajouterCopie(const Donnee& d);
  void ajouterCopie(const Valeur& v);

 private:
  std::string nom_;
  std::vector<Donnee*> params_;
  std::vector<std::unique_ptr<Donnee>> owned_;
  bool rejected_ = false;
};

namespace detail {
inline void addRef(Evt& e, Donnee* d) { e.ajouterReference(*d); }
inline void addRef(Evt& e, Donnee& d) { e.ajouterReference(d); }
inline void addRef(Evt& e, const char* text) { e.ajouterCopie(Valeur::texte(text)); }
inline void addRef(Evt& e, const std::string& text) { e.ajouterCopie(Valeur::texte(text)); }
inline void addVal(Evt& e, const Donnee* d) { e.ajouterCopie(*d); }
inline void addVal(Evt& e, const Donnee& d) { e.ajouterCopie(d); }
inline void addVal(Evt& e, const char* text) { e.ajouterCopie(Valeur::texte(text)); }
inline void addVal(Evt& e, const std::string& text) { e.ajouterCopie(Valeur::texte(text)); }
inline void addVal(Evt& e, const Valeur& v) { e.ajouterCopie(v); }
}  // namespace detail

// Parameters by reference: EvtParamRef(2, &VLIBCP1, &FLAG). A text literal is
// passed as a fresh Chaine that the callee may bind but that nobody reads back.
class EvtParamRef : public Evt {
 public:
  template <typename... Args>
  explicit EvtParamRef(int count, Args&&... args) {
    static_assert(sizeof...(Args) > 0);
    (detail::addRef(*this, std::forward<Args>(args)), ...);
    checkCount(count);
  }

 private:
  void checkCount(int count) const;
};

// Parameters by value: EvtParamVal(2, &IDENT, &V_MODE) copies them now.
// EvtParamVal(new InfoCode(0, 0, 0, 0, 0, 0)) is the empty event.
class EvtParamVal : public Evt {
 public:
  explicit EvtParamVal(InfoCode* code) : code_(code) {}
  template <typename... Args>
  explicit EvtParamVal(int count, Args&&... args) {
    (detail::addVal(*this, std::forward<Args>(args)), ...);
    checkCount(count);
  }

 private:
  void checkCount(int count) const;
  std::unique_ptr<InfoCode> code_;
};

}  // namespace host
