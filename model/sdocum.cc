#include "model/sdocum.h"

#include <algorithm>
#include <cstdio>

#include "host/error.h"
#include "host/session.h"
#include "host/snapshot.h"
#include "model/shown.h"
#include "model/step.h"

namespace model {

namespace {

// Every value of a binding's buffer, to put rows back after the image is emptied.
using Record = std::vector<std::pair<std::string, Valeur>>;

Record recordOf(Table& t) {
  Record r;
  for (const Colonne& c : t.colonnes()) r.emplace_back(c.name, t.valeur(c.name));
  return r;
}

// Order of a line from its NUMERO ("00000042|000003" -> 3); 0 when it has none.
int orderOf(const std::string& numero) {
  std::size_t bar = numero.rfind('|');
  if (bar == std::string::npos || bar + 1 == numero.size()) return 0;
  int order = 0;
  for (std::size_t i = bar + 1; i < numero.size(); ++i) {
    if (numero[i] < '0' || numero[i] > '9') return 0;
    order = order * 10 + (numero[i] - '0');
  }
  return order;
}

}  // namespace

Sdocum::Sdocum(Evt* e) : Setape(e) {
  addBaseBranch("DIALOGUE", [this](Evt* ev) { dialogue(ev); });
  addBaseBranch("APRES_VALIDATION", [this](Evt* ev) { apres_validation(ev); });
  addBaseBranch("APRES_DEBUT_CREATION", [this](Evt* ev) { apres_debut_creation(ev); });
  addBaseBranch("APRES_ABANDON", [this](Evt* ev) { apres_abandon(ev); });
  addBaseBranch("CTRL_DEBUT_LIGNE", [this](Evt* ev) { ctrl_debut_ligne(ev); });
  addBaseBranch("DEBUT_CREATION_LIGNE", [this](Evt* ev) { debut_creation_ligne(ev); });
  addBaseBranch("VALIDATION_LIGNE", [this](Evt* ev) { validation_ligne(ev); });
  addBaseBranch("APRES_VALIDATION_LIGNE", [this](Evt* ev) { apres_validation_ligne(ev); });
  addBaseBranch("APRES_SUPPRESSION_LIGNE", [this](Evt* ev) { apres_suppression_ligne(ev); });
  addBaseBranch("APRES_ABANDON_LIGNE", [this](Evt* ev) { apres_abandon_ligne(ev); });
  addBaseBranch("EXTRACTION_DONNEES", [this](Evt* ev) { extraction_donnees(ev); });
  addBaseBranch("VALIDATION_DONNEES", [this](Evt* ev) { validation_donnees(ev); });
  addBaseBranch("SUPPRESSION_DONNEES", [this](Evt* ev) { suppression_donnees(ev); });
  addBaseBranch("SELECTION", [this](Evt* ev) { selection(ev); });
  addBaseBranch("CTRL_CACHE_COLONNE ", [this](Evt* ev) { ctrl_cache_colonne(ev); });
  addBaseBranch("CTRL_CUSTOM_COLONNE", [this](Evt* ev) { ctrl_custom_colonne(ev); });
  addBaseBranch("CTRL_DEBUT_MODIF_LISTE", [this](Evt* ev) { ctrl_debut_modif_liste(ev); });
  addBaseBranch("AJOUTER_LIGNE", [this](Evt* ev) { ajouter_ligne(ev); });
  addBaseBranch("RENUMEROTE_LIGNES", [this](Evt* ev) { renumerote_lignes(ev); });
}

Sdocum::~Sdocum() = default;

void Sdocum::configureDocument(const char* headerGroups, const char* list, const char* lineTable) {
  header_groups_ = headerGroups ? headerGroups : "";
  list_ = list ? list : "";
  line_table_name_ = lineTable ? lineTable : "";
  line_ = tableNommee(line_table_name_);
  if (!line_) throw HostError("la table de lignes « " + line_table_name_ + " » n'est pas déclarée");
}

void Sdocum::controler(const char* name) {
  refused_control_ = name ? name : "";
  Automate::controler(name, "");
}

// ---------------------------------------------------------------------------- bindings

Table& Sdocum::image() {
  if (!image_) {
    image_ = std::make_unique<Table>(this, "", ("MEM:" + line_table_name_).c_str(), "MODEL_IMAGE");
    image_->initRequete();
    image_->activeRequete();
  }
  return *image_;
}

Table& Sdocum::saved() {
  if (!saved_lines_) saved_lines_ = std::make_unique<Table>(this, "", line_table_name_.c_str(), "MODEL_LINES");
  return *saved_lines_;
}

std::string Sdocum::numero(const std::string& ident, int order) const {
  char digits[16];
  std::snprintf(digits, sizeof digits, "%06d", order);
  return prefix(ident) + digits;
}

std::vector<std::string> Sdocum::imageNumeros() {
  std::vector<std::string> out;
  if (!line_) return out;
  Table& img = image();
  img.initRequete();
  img.activeRequete();
  for (int rc = img.suivant(3); rc == 0; rc = img.suivant(1)) out.push_back(img.valeur("NUMERO").chaine());
  return out;
}

bool Sdocum::readImageLine(const std::string& numero) {
  Table& img = image();
  Champ key("NUMERO", &img);
  if (img.lit(3, key, '=', Valeur::texte(numero)) != 0) return false;
  line_->raz();
  line_->copier(img);
  return true;
}

void Sdocum::showLine(const std::string& numero) {
  if (step(*this, "SELECTION") == Outcome::stopped) return;
  auto& shown = shown_variables_[numero];
  shown.clear();
  AmountDecimals decimals;
  for (const Donnee* d : variables()) shown[d->nom()] = shownText(d->valeur(), *this, decimals);
}

// ---------------------------------------------------------------------------- storage

void Sdocum::loadLines(bool extract) {
  if (!line_) return;
  clearLines();
  std::string ident = identifiantDocument();
  Table& from = saved();
  Champ link("NUMERO", &from);
  from.initRequete();
  from.ajouteFiltre(link, '/', prefix(ident));
  from.activeRequete();
  Table& img = image();
  int order = 0;
  for (int rc = from.suivant(3); rc == 0; rc = from.suivant(1)) {
    img.raz();
    img.copier(from);
    img.affecter("NUMERO", Valeur::texte(numero(ident, ++order)));
    img.ecrit();
  }
  for (const std::string& n : imageNumeros()) {
    readImageLine(n);
    if (extract && step(*this, "EXTRACTION_DONNEES") == Outcome::stopped) return;
    showLine(n);
    if (stopped(*this)) return;
  }
  line_->raz();
}

void Sdocum::clearLines() {
  current_.reset();
  in_entry_ = false;
  in_list_ = false;
  shown_variables_.clear();
  if (!line_) return;
  Table& img = image();
  img.initRequete();
  img.vide();
  img.activeRequete();
  line_->raz();
}

void Sdocum::keepState(host::Snapshot& snapshot) {
  Setape::keepState(snapshot);
  snapshot.keep(current_, in_entry_, in_list_, line_stored_, shown_variables_, refused_control_);
}

void Sdocum::deleteLines(const std::string& ident) {
  if (!line_) return;
  Table& old = saved();
  Champ link("NUMERO", &old);
  old.initRequete();
  old.ajouteFiltre(link, '/', prefix(ident));
  old.activeRequete();
  // Always the first one left: each line is deleted once its data are.
  while (old.suivant(3) == 0) {
    line_->raz();
    line_->copier(old);
    Outcome outcome = step(*this, "SUPPRESSION_DONNEES");
    if (outcome == Outcome::stopped) return;
    if (outcome == Outcome::refused)
      throw HostError("la suppression des données de la ligne « " + old.valeur("NUMERO").chaine() + " » a été refusée");
    old.supprime();
  }
}

void Sdocum::saveLines(const std::string& ident) {
  if (!line_) return;
  deleteLines(ident);
  if (stopped(*this)) return;
  int order = 0;
  for (const std::string& n : imageNumeros()) {
    readImageLine(n);
    line_->affecter("NUMERO", Valeur::texte(numero(ident, ++order)));
    line_->ecrit();
    Outcome outcome = step(*this, "VALIDATION_DONNEES");
    if (outcome == Outcome::stopped) return;
    if (outcome == Outcome::refused)
      throw HostError("l'enregistrement des données de la ligne " + std::to_string(order) + " a été refusé");
  }
  line_->raz();
}

// ---------------------------------------------------------------------------- standard events

void Sdocum::dialogue(Evt* e) {
  if (e->nbParams() < 2) throw HostError("« DIALOGUE » attend deux paramètres, TYPE et REPONSE");
  std::string type = e->parametre(0).chaine();
  std::string question =
      type == "VA_CREAT" ? "Voulez-vous créer une nouvelle fiche ?" : "Confirmez-vous (« " + type + " ») ?";
  e->parametre(1) = session().demander(question) ? 1 : 0;
}

void Sdocum::apres_validation(Evt*) {}
void Sdocum::apres_debut_creation(Evt*) {}
void Sdocum::apres_abandon(Evt*) {}
void Sdocum::ctrl_debut_ligne(Evt*) {}
void Sdocum::debut_creation_ligne(Evt*) {}
void Sdocum::apres_validation_ligne(Evt*) {}
void Sdocum::apres_suppression_ligne(Evt*) {}
void Sdocum::extraction_donnees(Evt*) {}
void Sdocum::validation_donnees(Evt*) {}
void Sdocum::suppression_donnees(Evt*) {}
void Sdocum::selection(Evt*) {}
void Sdocum::ctrl_cache_colonne(Evt*) {}
void Sdocum::ctrl_custom_colonne(Evt*) {}

void Sdocum::validation_ligne(Evt*) {
  if (!in_entry_ || !current_ || !line_) return;
  Table& img = image();
  std::string n = *current_;
  if (n.empty()) {
    int next = 0;
    for (const std::string& existing : imageNumeros()) next = std::max(next, orderOf(existing));
    n = numero(identifiantDocument(), next + 1);
  }
  Champ key("NUMERO", &img);
  if (img.lit(3, key, '=', Valeur::texte(n)) != 0) img.raz();
  img.copier(*line_);
  img.affecter("NUMERO", Valeur::texte(n));
  img.ecrit();
  line_->affecter("NUMERO", Valeur::texte(n));
  current_ = n;
  line_stored_ = true;
}

void Sdocum::apres_abandon_ligne(Evt*) { discardLineEntry(); }

void Sdocum::ctrl_debut_modif_liste(Evt* e) {
  if (!beginLineChange()) rejeter(e);
}

void Sdocum::ajouter_ligne(Evt*) {
  if (!line_) throw HostError("« AJOUTER_LIGNE » sans table de lignes");
  int next = 0;
  for (const std::string& existing : imageNumeros()) next = std::max(next, orderOf(existing));
  std::string n = numero(identifiantDocument(), next + 1);
  line_->affecter("NUMERO", Valeur::texte(n));
  Table& img = image();
  img.raz();
  img.copier(*line_);
  img.ecrit();
}

void Sdocum::renumerote_lignes(Evt*) {
  if (!line_) return;
  std::string ident = identifiantDocument();
  Table& img = image();
  std::vector<Record> lines;
  std::vector<std::string> numbers = imageNumeros();
  for (const std::string& n : numbers) {
    Champ key("NUMERO", &img);
    img.lit(3, key, '=', Valeur::texte(n));
    lines.push_back(recordOf(img));
  }
  img.initRequete();
  img.vide();
  img.activeRequete();
  std::map<std::string, std::map<std::string, std::string>> shown;
  for (std::size_t i = 0; i < lines.size(); ++i) {
    std::string n = numero(ident, static_cast<int>(i) + 1);
    img.raz();
    for (const auto& [name, value] : lines[i]) img.affecter(name, value);
    img.affecter("NUMERO", Valeur::texte(n));
    img.ecrit();
    if (auto it = shown_variables_.find(numbers[i]); it != shown_variables_.end()) shown[n] = it->second;
    if (current_ && *current_ == numbers[i]) {
      current_ = n;
      line_->affecter("NUMERO", Valeur::texte(n));
    }
  }
  shown_variables_ = std::move(shown);
}

// ---------------------------------------------------------------------------- the line cycle

bool Sdocum::refusedInVisu() { return modeCourant() != "C" && modeCourant() != "M"; }

bool Sdocum::enterList() {
  if (in_list_ || modeCourant() == "V") return true;
  std::size_t from = 0;
  while (from <= header_groups_.size()) {
    std::size_t comma = header_groups_.find(',', from);
    std::string group = header_groups_.substr(from, comma == std::string::npos ? std::string::npos : comma - from);
    from = comma == std::string::npos ? header_groups_.size() + 1 : comma + 1;
    if (group.empty()) continue;
    if (group == list_) break;
    if (step(*this, group + "_SORTIE") != Outcome::accepted) return false;
  }
  if (step(*this, list_ + "_ENTREE") != Outcome::accepted) return false;
  in_list_ = true;
  return true;
}

bool Sdocum::newLine() {
  if (!line_) throw HostError("le document n'a pas de liste de lignes");
  if (refusedInVisu() || !enterList() || !closeLineEntry()) return false;
  line_->raz();
  current_ = "";
  in_entry_ = true;
  if (step(*this, "CTRL_DEBUT_LIGNE") == Outcome::accepted &&
      step(*this, "DEBUT_CREATION_LIGNE") == Outcome::accepted)
    return true;
  current_.reset();
  in_entry_ = false;
  return false;
}

bool Sdocum::goToLine(int n) {
  if (!line_) throw HostError("le document n'a pas de liste de lignes");
  std::vector<std::string> numbers = imageNumeros();
  if (n < 1 || n > static_cast<int>(numbers.size()))
    throw HostError("la liste « " + list_ + " » n'a pas de ligne " + std::to_string(n));
  if (!enterList() || !closeLineEntry()) return false;
  // Validating the line left may have changed the lines.
  numbers = imageNumeros();
  if (n > static_cast<int>(numbers.size())) return false;
  readImageLine(numbers[n - 1]);
  current_ = numbers[n - 1];
  in_entry_ = false;
  showLine(numbers[n - 1]);
  if (step(*this, "CTRL_DEBUT_LIGNE") == Outcome::accepted) return true;
  current_.reset();
  return false;
}

bool Sdocum::beginLineChange() {
  if (in_entry_) return true;
  if (refusedInVisu() || !current_) return false;
  in_entry_ = true;
  return true;
}

bool Sdocum::validateLine() {
  if (!in_entry_) return true;
  line_stored_ = false;
  if (step(*this, "VALIDATION_LIGNE") == Outcome::stopped || !line_stored_) return false;
  line_stored_ = false;
  in_entry_ = false;
  showLine(*current_);
  return step(*this, "APRES_VALIDATION_LIGNE") != Outcome::stopped;
}

bool Sdocum::closeLineEntry() { return validateLine(); }

void Sdocum::discardLineEntry() {
  if (!in_entry_) return;
  in_entry_ = false;
  if (current_ && !current_->empty() && readImageLine(*current_)) return;
  current_.reset();
  if (line_) line_->raz();
}

bool Sdocum::deleteLine() {
  if (refusedInVisu() || !current_) return false;
  if (!current_->empty()) {
    Table& img = image();
    Champ key("NUMERO", &img);
    if (img.lit(3, key, '=', Valeur::texte(*current_)) == 0) img.supprime();
    shown_variables_.erase(*current_);
  }
  current_.reset();
  in_entry_ = false;
  line_->raz();
  return step(*this, "APRES_SUPPRESSION_LIGNE") != Outcome::stopped;
}

void Sdocum::catchUpList() {
  if (!line_ || !ecran()->takeRedisplay(list_)) return;
  Record inEntry = recordOf(*line_);
  for (const std::string& n : imageNumeros()) {
    if (current_ && *current_ == n) continue;
    readImageLine(n);
    showLine(n);
    if (stopped(*this)) return;
  }
  line_->raz();
  for (const auto& [name, value] : inEntry) line_->affecter(name, value);
  if (!current_) return;
  if (current_->empty())
    step(*this, "SELECTION");
  else
    showLine(*current_);
}

bool Sdocum::abandonLine() { return step(*this, "APRES_ABANDON_LIGNE") != Outcome::stopped; }

std::vector<RowText> Sdocum::rows() {
  std::vector<RowText> out;
  if (!line_) return out;
  Table& img = image();
  AmountDecimals decimals;
  for (const std::string& n : imageNumeros()) {
    Champ key("NUMERO", &img);
    img.lit(3, key, '=', Valeur::texte(n));
    RowText row;
    for (const Colonne& c : img.colonnes()) {
      std::string text = shownText(img.valeur(c.name), *this, decimals);
      row[line_->alias() + "." + c.name] = text;
      row[c.name] = text;
    }
    if (auto it = shown_variables_.find(n); it != shown_variables_.end())
      for (const auto& [name, text] : it->second) row[name] = text;
    out.push_back(std::move(row));
  }
  return out;
}

int Sdocum::currentLine() {
  if (!current_ || current_->empty()) return 0;
  std::vector<std::string> numbers = imageNumeros();
  for (std::size_t i = 0; i < numbers.size(); ++i)
    if (numbers[i] == *current_) return static_cast<int>(i) + 1;
  return 0;
}

}  // namespace model
