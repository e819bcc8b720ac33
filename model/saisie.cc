#include "model/saisie.h"

#include "host/counter.h"
#include "host/error.h"
#include "host/session.h"
#include "host/snapshot.h"
#include "host/table.h"
#include "model/step.h"

namespace model {

namespace {

// Identifiers of headers are drawn from the counter named after the main table.
constexpr int kIdentWidth = 8;

const char* modeStartEvent(char mode) {
  switch (mode) {
    case 'C': return "DEBUT_CREATION";
    case 'M': return "DEBUT_MODIFICATION";
    default: return "DEBUT_VISUALISATION";
  }
}

}  // namespace

// ---------------------------------------------------------------------------- AutomTab

AutomTab::AutomTab(Evt* e) : Automate(e) {
  addBaseBranch("DEBUT", [this](Evt* ev) { debut(ev); });
  addBaseBranch("SELECTION_TRI", [this](Evt* ev) { selection_tri(ev); });
  addBaseBranch("CTRL_DEFAUT_COLONNE", [this](Evt* ev) { ctrl_defaut_colonne(ev); });
  addBaseBranch("CTRL_BASCULER", [this](Evt* ev) { ctrl_basculer(ev); });
  addBaseBranch("CTRL_ACTUALISER_BASCULE", [this](Evt* ev) { ctrl_actualiser_bascule(ev); });
}

void AutomTab::planTri(const char* plan, const char* index) {
  sort_plan_ = plan ? plan : "";
  sort_index_ = index ? index : "";
}

// ---------------------------------------------------------------------------- Saisie

Saisie::Saisie(Evt* e) : AutomTab(e) {
  addBaseBranch("AVANT_SUPPRESSION", [this](Evt* ev) { avant_suppression(ev); });
  addBaseBranch("DEBUT_VISUALISATION", [this](Evt* ev) { debut_visualisation(ev); });
  addBaseBranch("DEBUT_MODIFICATION", [this](Evt* ev) { debut_modification(ev); });
  addBaseBranch("DEBUT_CREATION", [this](Evt* ev) { debut_creation(ev); });
  addBaseBranch("FIN_CREATION", [this](Evt* ev) { fin_creation(ev); });
  addBaseBranch("VALIDATION", [this](Evt* ev) { validation(ev); });
  addBaseBranch("CTRL_OUVRE", [this](Evt* ev) { ctrl_ouvre(ev); });
  addBaseBranch("CTRL_ACTUALISER_MODE", [this](Evt* ev) { ctrl_actualiser_mode(ev); });
  addBaseBranch("CREATION", [this](Evt* ev) { creation(ev); });
  addBaseBranch("SUPPRESSION", [this](Evt* ev) { suppression(ev); });
}

void Saisie::modeSaisie(std::string_view modes) {
  std::string allowed;
  char start = 0;
  for (std::size_t i = 0; i < modes.size(); ++i) {
    char c = modes[i];
    bool last = i + 1 == modes.size();
    if (std::string_view("CMVA").find(c) != std::string_view::npos && allowed.find(c) == std::string::npos)
      allowed += c;
    else if (last && std::string_view("cmv").find(c) != std::string_view::npos)
      start = static_cast<char>(c - 'a' + 'A');
    else
      throw HostError("mode de saisie « " + std::string(modes) + " » : lettre « " + std::string(1, c) + " » inconnue");
  }
  if (start && !allowed.empty() && allowed.find(start) == std::string::npos)
    throw HostError("mode de saisie « " + std::string(modes) + " » : le mode de départ n'est pas permis");
  allowed_ = allowed;
  start_ = start;
}

bool Saisie::modePermis(char m) const { return allowed_.empty() || allowed_.find(m) != std::string::npos; }

void Saisie::avant_suppression(Evt*) { deletion_allowed_ = true; }
void Saisie::debut_visualisation(Evt*) {}
void Saisie::debut_modification(Evt*) {}
void Saisie::debut_creation(Evt*) {}
void Saisie::fin_creation(Evt*) {}
void Saisie::ctrl_ouvre(Evt*) {}
void Saisie::ctrl_actualiser_mode(Evt*) {}

std::string Saisie::identifiantDocument() { return table(false)->valeur("IDENT").chaine(); }

void Saisie::enterMode(char m, bool announce) {
  mode_ = m;
  if (announce) step(*this, modeStartEvent(m));
}

void Saisie::makeNew(Table& t) {
  std::vector<std::pair<std::string, Valeur>> values;
  for (const Colonne& c : t.colonnes()) values.emplace_back(c.name, t.valeur(c.name));
  t.raz();
  for (const auto& [name, value] : values) t.affecter(name, value);
}

void Saisie::keepState(host::Snapshot& snapshot) {
  AutomTab::keepState(snapshot);
  snapshot.keep(saved_, deletion_allowed_, mode_);
}

void Saisie::applyVisuRequest() {
  if (!ecran()->visuDemandee()) return;
  ecran()->oublierVisu();
  // A creation has nothing saved to show; visualisation applies to a saved document.
  if (mode_ != 'M') return;
  discardLineEntry();
  enterMode('V');
}

void Saisie::demarrer() {
  if (step(*this, "INIT") != Outcome::accepted || step(*this, "AVANT_DEBUT") != Outcome::accepted ||
      step(*this, "DEBUT") != Outcome::accepted) {
    sortir(nullptr, 0);
    return;
  }
  Evt* launch = lancement();
  std::string ident = launch->nbParams() > 0 ? launch->parametre(0).chaine() : std::string();
  char start = start_ ? start_ : (ident.empty() ? 'C' : 'V');
  if (start == 'C' || ident.empty()) {
    if (step(*this, "CREATION") != Outcome::accepted) sortir(nullptr, 0);
  } else if (!openDocument(ident)) {
    sortir(nullptr, 0);
  } else if (start == 'M') {
    step(*this, "MODIFICATION");
    applyVisuRequest();
    // A refused request to modify leaves the document shown as it is.
    if (!mode_ && !stopped(*this)) enterMode('V');
  } else {
    enterMode('V');
  }
  if (session().actionEchouee()) sortir(nullptr, 0);
}

bool Saisie::openDocument(const std::string& ident) {
  Table& header = *table(false);
  Champ key("IDENT", &header);
  if (header.lit(3, key, '=', Valeur::texte(ident)) != 0) {
    session().montrer("La fiche « " + ident + " » est introuvable.");
    return false;
  }
  Outcome sorted = step(*this, "SELECTION_TRI");
  if (sorted == Outcome::refused)
    session().montrer("La fiche « " + ident + " » n'est pas accessible depuis cet écran.");
  if (sorted != Outcome::accepted) return false;
  loadLines(true);
  if (stopped(*this)) return false;
  return step(*this, "DEBUT_FICHE") != Outcome::stopped;
}

void Saisie::creation(Evt* e) {
  if (!modePermis('C') || !closeLineEntry()) {
    rejeter(e);
    return;
  }
  table(false)->raz();
  clearLines();
  enterMode('C');
  if (step(*this, "DEBUT_FICHE") == Outcome::stopped) return;
  step(*this, "APRES_DEBUT_CREATION");
}

void Saisie::validation(Evt*) {
  if (mode_ != 'C' && mode_ != 'M') return;
  Table& header = *table(false);
  std::string ident;
  if (mode_ == 'C') {
    // Made a new record again: an earlier attempt that was undone must not turn
    // this insert into an update of a row that no longer exists.
    makeNew(header);
    ident = host::nextIdentifier(session().base(), nomTable(), kIdentWidth);
    header.affecter("IDENT", Valeur::texte(ident));
  } else {
    ident = identifiantDocument();
  }
  header.ecrit();
  saveLines(ident);
  if (stopped(*this)) return;
  saved_ = true;
  // The user is about to be told the document is saved.
  session().base().forcer();
}

void Saisie::suppression(Evt* e) {
  if (mode_ == 0 || mode_ == 'C' || !modePermis('A')) {
    rejeter(e);
    return;
  }
  discardLineEntry();
  deletion_allowed_ = false;
  if (step(*this, "AVANT_SUPPRESSION") == Outcome::stopped) return;
  if (!deletion_allowed_) {
    rejeter(e);
    return;
  }
  deletion_allowed_ = false;
  deleteLines(identifiantDocument());
  if (stopped(*this)) return;
  table(false)->supprime();
  session().base().forcer();
  clearLines();
  // The document is gone: nothing is left to show.
  sortir(e, 0);
}

// ---------------------------------------------------------------------------- Setape

Setape::Setape(Evt* e) : Saisie(e) {
  addBaseBranch("MODIFICATION", [this](Evt* ev) { modification(ev); });
  addBaseBranch("VALID_DOC", [this](Evt* ev) { valid_doc(ev); });
  addBaseBranch("ABAND_DOC", [this](Evt* ev) { aband_doc(ev); });
}

void Setape::modification(Evt* e) {
  std::string mode = modeCourant();
  if (mode == "M") return;
  if (mode == "C" || !modePermis('M')) {
    rejeter(e);
    return;
  }
  enterMode('M');
}

void Setape::valid_doc(Evt* e) {
  std::string mode = modeCourant();
  if ((mode != "C" && mode != "M") || !closeLineEntry()) {
    rejeter(e);
    return;
  }
  saved_ = false;
  if (step(*this, "VALIDATION") == Outcome::stopped) return;
  if (!saved_) {
    rejeter(e);
    return;
  }
  saved_ = false;
  if (step(*this, "APRES_VALIDATION") == Outcome::stopped) return;
  // The lines as saved, with their final numbers.
  loadLines(false);
  if (mode == "C") {
    if (step(*this, "FIN_CREATION") == Outcome::stopped) return;
    Chaine type("VA_CREAT");
    Entier reponse(1);
    EvtParamRef question(2, &type, &reponse);
    if (step(*this, "DIALOGUE", &question) == Outcome::stopped) return;
    if (reponse.entier() != 0)
      step(*this, "CREATION");
    else if (modePermis('V'))
      enterMode('V');
    else
      sortir(e, 0);
  }
  applyVisuRequest();
}

void Setape::aband_doc(Evt* e) {
  discardLineEntry();
  if (modeCourant() == "C" || modeCourant().empty()) {
    clearLines();
    sortir(e, 0);
    return;
  }
  Table& header = *table(false);
  Champ key("IDENT", &header);
  if (header.lit(3, key, '=', Valeur::texte(identifiantDocument())) != 0) {
    // Removed meanwhile by someone else: nothing left to show.
    sortir(e, 0);
    return;
  }
  loadLines(false);
  step(*this, "APRES_ABANDON");
}

}  // namespace model
