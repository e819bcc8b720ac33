#include "model/acces.h"

#include "host/error.h"
#include "host/session.h"
#include "host/table.h"
#include "model/step.h"

namespace model {

namespace {
const char kList[] = "LST";
}

// ---------------------------------------------------------------------------- Scritere

Scritere::Scritere(Evt* e) : Traitecr(e) {
  addBaseBranch("ACTIVE_REQUETE", [this](Evt* ev) { active_requete(ev); });
}

void Scritere::active_requete(Evt*) {
  // Every row until the handler says otherwise.
  table(false)->initRequete();
  table(false)->activeRequete();
  out_of_date_ = true;
}

bool Scritere::startSteps() {
  return step(*this, "INIT") == Outcome::accepted && step(*this, "DEBUT") == Outcome::accepted;
}

void Scritere::demarrer() {
  if (!startSteps() || step(*this, "ACTIVE_REQUETE") == Outcome::stopped) {
    sortir(nullptr, 0);
    return;
  }
  refreshList();
  if (session().actionEchouee()) sortir(nullptr, 0);
}

void Scritere::reactiver() {
  if (step(*this, "DEBUT_ACTIVATION") == Outcome::stopped) return;
  refreshList();
}

void Scritere::refreshList() {
  if (!out_of_date_ || stopped(*this)) return;
  fill();
}

void Scritere::fill() {
  host::Table& main = *table(false);
  out_of_date_ = false;
  shown_.clear();
  rows_.clear();
  selected_ = 0;
  const std::string list = kList;
  for (int rc = main.suivant(3); rc == 0; rc = main.suivant(1)) {
    Outcome outcome = step(*this, list + "_SELECTION");
    if (outcome == Outcome::stopped) return;
    if (outcome == Outcome::refused) continue;
    Shown row;
    for (const host::Colonne& c : main.colonnes()) {
      host::Valeur v = main.valeur(c.name);
      row.text[main.alias() + "." + c.name] = v.chaine();
      row.text[c.name] = v.chaine();
      if (c.key) row.keys.emplace_back(c.name, v);
    }
    // A variable shadows a field of the same bare name; "TABLE.FIELD" stays the field.
    for (const host::Donnee* d : variables()) row.text[d->nom()] = d->chaine();
    shown_.push_back(std::move(row));
  }
  for (const Shown& s : shown_) rows_.push_back(s.text);
  if (step(*this, list + (shown_.empty() ? "_LISTE_VIDE" : "_LISTE_PLEINE")) == Outcome::stopped) return;
  if (!shown_.empty()) selectRow(1);
}

void Scritere::selectRow(int n) {
  if (n < 1 || n > static_cast<int>(shown_.size()))
    throw host::HostError("la liste « " + std::string(kList) + " » n'a pas de ligne " + std::to_string(n));
  host::Table& main = *table(false);
  const Shown& row = shown_[n - 1];
  if (row.keys.size() == 1) {
    host::Champ key(row.keys[0].first.c_str(), &main);
    if (main.lit(3, key, '=', row.keys[0].second) != 0)
      throw host::HostError("la ligne " + std::to_string(n) + " de la liste n'existe plus dans « " + main.alias() + " »");
  } else {
    // Without a one-field key the row cannot be read again: its values are put back.
    main.raz();
    for (const host::Colonne& c : main.colonnes())
      main.affecter(c.name, host::Valeur::depuisTexte(c.genre, row.text.at(main.alias() + "." + c.name), c.name));
  }
  selected_ = n;
}

// ---------------------------------------------------------------------------- Acces

Acces::Acces(Evt* e) : Scritere(e) {
  addBaseBranch("AVANT_DEBUT", [this](Evt* ev) { avant_debut(ev); });
  addBaseBranch("DEBUT_ACTIVATION", [this](Evt* ev) { debut_activation(ev); });
  addBaseBranch("CREER", [this](Evt* ev) { creer(ev); });
  addBaseBranch("MODIFIER", [this](Evt* ev) { modifier(ev); });
  addBaseBranch("GERER", [this](Evt* ev) { gerer(ev); });
  addBaseBranch("IMPR_FICHE", [this](Evt* ev) { impr_fiche(ev); });
  addBaseBranch("IMPR_LISTE", [this](Evt* ev) { impr_liste(ev); });
}

void Acces::init(Evt* e) { Traitecr::init(e); }
void Acces::avant_debut(Evt*) {}
void Acces::debut_activation(Evt*) { appelerProcedure("", "", "", "ACTIVE_REQUETE", nullptr, 0); }
void Acces::creer(Evt*) {}
void Acces::modifier(Evt*) {}
void Acces::gerer(Evt*) {}
void Acces::impr_fiche(Evt*) {}
void Acces::impr_liste(Evt*) {}

bool Acces::startSteps() {
  return step(*this, "INIT") == Outcome::accepted && step(*this, "AVANT_DEBUT") == Outcome::accepted &&
         step(*this, "DEBUT") == Outcome::accepted;
}

// ---------------------------------------------------------------------------- Acces2

Acces2::Acces2(Evt* e) : Acces(e) {}

void Acces2::avant_debut(Evt* e) { Acces::avant_debut(e); }

}  // namespace model
