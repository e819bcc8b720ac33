#include "model/acces.h"

#include "host/error.h"
#include "host/session.h"
#include "host/snapshot.h"
#include "host/table.h"
#include "model/shown.h"
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
  // A new list: the one it replaces may still be kept for a failed action to put back.
  pages_.clear();
  count_ = 0;
  complete_ = false;
  resume_.reset();
  selected_ = 0;
  alias_ = main.alias();
  columns_ = main.colonnes();
  variables_.clear();
  for (const host::Donnee* d : variables()) variables_.push_back(d->nom());
  int keys = 0;
  for (std::size_t i = 0; i < columns_.size(); ++i)
    if (columns_[i].key) {
      ++keys;
      keyColumn_ = static_cast<int>(i);
    }
  if (keys != 1) keyColumn_ = -1;

  if (!readPage()) return;
  const std::string list = kList;
  if (step(*this, list + (count_ == 0 ? "_LISTE_VIDE" : "_LISTE_PLEINE")) == Outcome::stopped) return;
  if (count_ > 0) selectRow(1);
}

bool Scritere::readPage() {
  host::Table& main = *table(false);
  // The variables are the screen's own: no handler's local lives between rows.
  const std::vector<host::Donnee*> shownVariables = variables();
  const std::string selection = std::string(kList) + "_SELECTION";
  // Without a one-field key the request cannot be taken up again: it is read whole.
  const bool resumable = keyColumn_ >= 0;
  AmountDecimals decimals;
  auto page = std::make_shared<Page>();
  auto keep = [&] {
    if (page->empty()) return;
    page->shrink_to_fit();
    count_ += page->size();
    pages_.push_back(std::move(page));
    page = std::make_shared<Page>();
  };
  int rc;
  if (resume_) {
    main.replacer(*resume_);
    rc = main.suivant(1);
  } else {
    rc = main.suivant(3);
  }
  for (; rc == 0; rc = main.suivant(1)) {
    host::Table::Position here = main.position();
    Outcome outcome = step(*this, selection);
    if (outcome == Outcome::stopped) return false;
    if (outcome == Outcome::accepted) {
      Shown row;
      for (std::size_t i = 0; i < columns_.size(); ++i) {
        host::Valeur v = main.valeur(columns_[i].name);
        row.values += shownText(v, *this, decimals);
        row.values += '\0';
        if (static_cast<int>(i) == keyColumn_) row.key = std::move(v);
      }
      for (const host::Donnee* d : shownVariables) {
        row.values += shownText(d->valeur(), *this, decimals);
        row.values += '\0';
      }
      row.values.shrink_to_fit();
      page->push_back(std::move(row));
    }
    if (page->size() == kPage) {
      keep();
      if (resumable) {
        resume_ = std::move(here);
        return true;
      }
    }
  }
  keep();
  complete_ = true;
  resume_.reset();
  return true;
}

bool Scritere::readUntil(std::size_t n) {
  bool read = false;
  while (count_ < n && !complete_) {
    if (!readPage()) return false;
    read = true;
  }
  // Reading moved the main table's buffer: it goes back on the selected row.
  if (read && selected_ > 0) selectRow(selected_);
  return count_ >= n;
}

void Scritere::keepState(host::Snapshot& snapshot) {
  Traitecr::keepState(snapshot);
  snapshot.keep(out_of_date_, alias_, columns_, variables_, keyColumn_, pages_, count_, complete_, resume_,
                selected_);
}

const Scritere::Shown& Scritere::shown(int n) const {
  checkRow(n);
  auto at = static_cast<std::size_t>(n - 1);
  return (*pages_[at / kPage])[at % kPage];
}

void Scritere::checkRow(int n) const {
  if (n < 1 || static_cast<std::size_t>(n) > count_)
    throw host::HostError("la liste « " + std::string(kList) + " » n'a pas de ligne " + std::to_string(n));
}

RowText Scritere::row(int n) const {
  const std::string& packed = shown(n).values;
  RowText text;
  std::size_t at = 0;
  auto next = [&] {
    std::size_t end = packed.find('\0', at);
    std::string value = packed.substr(at, end - at);
    at = end + 1;
    return value;
  };
  for (const host::Colonne& c : columns_) {
    std::string value = next();
    text[alias_ + "." + c.name] = value;
    text[c.name] = std::move(value);
  }
  // A variable shadows a field of the same bare name; "TABLE.FIELD" stays the field.
  for (const std::string& name : variables_) text[name] = next();
  return text;
}

std::vector<RowText> Scritere::rows() const {
  std::vector<RowText> out;
  out.reserve(count_);
  for (std::size_t n = 1; n <= count_; ++n) out.push_back(row(static_cast<int>(n)));
  return out;
}

void Scritere::selectRow(int n) {
  const Shown& chosen = shown(n);
  host::Table& main = *table(false);
  if (keyColumn_ >= 0) {
    host::Champ key(columns_[keyColumn_].name.c_str(), &main);
    if (main.lit(3, key, '=', chosen.key) != 0)
      throw host::HostError("la ligne " + std::to_string(n) + " de la liste n'existe plus dans « " + main.alias() + " »");
  } else {
    // Without a one-field key the row cannot be read again: its values are put back.
    RowText text = row(n);
    main.raz();
    for (const host::Colonne& c : columns_)
      main.affecter(c.name, host::Valeur::depuisTexte(c.genre, text.at(alias_ + "." + c.name), c.name));
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
