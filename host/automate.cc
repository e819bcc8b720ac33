#include "host/automate.h"

#include <algorithm>

#include "host/currency.h"
#include "host/error.h"
#include "host/session.h"
#include "host/snapshot.h"
#include "host/table.h"

namespace host {

Automate::Automate(Evt* lancement) : launch_(lancement), session_(&Session::courante()) {
  if (!launch_) {
    empty_launch_ = std::make_unique<EvtParamVal>(new InfoCode(0, 0, 0, 0, 0, 0));
    launch_ = empty_launch_.get();
  }
  main_table_ = std::make_unique<Table>(this, "", "", "");
}

Automate::~Automate() {
  main_table_.reset();
  // Variables and tables of a derived class are gone already; forget the rest.
  variables_.clear();
  tables_.clear();
}

Session& Automate::session() const { return *session_; }

// ---------------------------------------------------------------------------- branches

void Automate::addBranch(std::string name, Handler handler) {
  if (branches_.find(name) == branches_.end()) branch_order_.push_back(name);
  branches_[std::move(name)] = std::move(handler);
}

void Automate::addBaseBranch(std::string name, Handler handler) { base_branches_[std::move(name)] = std::move(handler); }

bool Automate::aBranche(std::string_view name) const {
  return branches_.find(name) != branches_.end() || base_branches_.find(name) != base_branches_.end();
}

void Automate::executer(std::string_view name, Evt* e) {
  const Handler* found = nullptr;
  if (auto own = branches_.find(name); own != branches_.end())
    found = &own->second;
  else if (auto base = base_branches_.find(name); base != base_branches_.end())
    found = &base->second;
  if (!found) throw HostError("branche « " + std::string(name) + " » inconnue du module « " + code_ + " »");
  std::unique_ptr<Evt> empty;
  if (!e) {
    empty = std::make_unique<EvtParamVal>(new InfoCode(0, 0, 0, 0, 0, 0));
    e = empty.get();
  }
  std::string previous = e->nom();
  e->setNom(std::string(name));
  error_code_ = 0;
  Handler handler = *found;  // the branch table may change while it runs
  try {
    handler(e);
  } catch (HostError& error) {
    error.setEvenement(std::string(name));
    e->adresseC = &error;
    exception(e);
    e->adresseC = nullptr;
  }
  e->setNom(previous);
}

// ---------------------------------------------------------------------------- calls by name

void Automate::appelerProcedure(const char* base, const char* source, const char* module, const char* procedure,
                                Evt* e, int) {
  std::string library = Registre::nomModule(base ? base : "", source ? source : "", module ? module : "");
  if (library.empty()) {
    executer(procedure, e);
    return;
  }
  Automate& callee = session_->bibliotheque(library);
  callee.executer(procedure, e);
  error_code_ = callee.erreurMethode();
}

void Automate::lancerProcedure(const char* base, const char* source, const char* module, const char* procedure,
                               Evt*, int) {
  if (!Registre::nomModule(base ? base : "", source ? source : "", module ? module : "").empty())
    throw HostError(std::string("seule une branche du module peut être mise en file (« ") + procedure + " »)");
  if (!aBranche(procedure)) throw HostError("branche « " + std::string(procedure) + " » inconnue du module « " + code_ + " »");
  session_->enfiler(this, procedure);
}

void Automate::appelerModule(const char* base, const char* source, const char* module, Evt* e) {
  std::string name = Registre::nomModule(base ? base : "", source ? source : "", module ? module : "");
  session_->executer(Registre::instance().creer(name, e));
}

void Automate::lancerModule(const char* base, const char* source, const char* module, Evt* e) {
  std::unique_ptr<Evt> owned(e);
  std::string name = Registre::nomModule(base ? base : "", source ? source : "", module ? module : "");
  AutomatePtr automate = Registre::instance().creer(name, e);
  automate->empty_launch_ = std::move(owned);
  session_->ouvrir(std::move(automate));
}

// ---------------------------------------------------------------------------- results, refusals

void Automate::rejeter(Evt* e) {
  if (e) e->setRejete(true);
  refused_ = true;
}

void Automate::sortir(Evt*, int) { ended_ = true; }

void Automate::controler(const char* field, const char*) { screen_.setFocus(field ? field : ""); }

void Automate::exception(Evt* e) {
  HostError* error = e ? e->adresseC : nullptr;
  session_->signalerErreur(error ? error->evenement() : (e ? e->nom() : ""),
                           error ? error->what() : "erreur inconnue");
}

// ---------------------------------------------------------------------------- user port

std::string Automate::libelle(std::string_view code) {
  std::vector<std::string> tables = label_tables_;
  if (tables.empty()) tables = {"LIBE1", "LIBEL"};
  return session_->libelle(tables, code);
}

void Automate::BoiteMessage(std::string_view text, int, void*) { session_->montrer(std::string(text)); }

std::string Automate::BoiteDialogue(std::string_view title, std::string_view text, int,
                                    const std::vector<std::string>& choices) {
  return session_->dialoguer(std::string(title), std::string(text), choices);
}

// ---------------------------------------------------------------------------- identity

void Automate::nomLibelles(const char* first, const char* second) {
  label_tables_.clear();
  if (first && *first) label_tables_.emplace_back(first);
  if (second && *second) label_tables_.emplace_back(second);
}

void Automate::nomTable(const char* name, void*) {
  main_table_name_ = name ? name : "";
  main_table_->renommer(main_table_name_);
}

std::string Automate::nomSource() const {
  std::size_t dash = code_.find('-');
  return dash == std::string::npos ? code_ : code_.substr(0, dash);
}

Table* Automate::table(bool) { return main_table_.get(); }

// ---------------------------------------------------------------------------- standard events

void Automate::debut(Evt*) {}
void Automate::selection_tri(Evt*) {}
void Automate::ctrl_defaut_colonne(Evt*) {}
void Automate::ctrl_basculer(Evt* e) {
  Devises& devises = euro();
  std::string from = devises.courante();
  Decimal fromRate = devises.coursCourant();
  if (aBranche("CTRL_ACTUALISER_MODE")) {
    executer("CTRL_ACTUALISER_MODE", e);
    if (error_code_ != 0) return;
  }
  std::string options = e && e->nbParams() > 3 ? e->parametre(3).chaine() : std::string();
  std::string to = devises.courante();
  if (to != from && options.find('D') == std::string::npos) {
    Decimal toRate = devises.coursCourant();
    if (fromRate.sign() <= 0)
      throw HostError("cours « " + fromRate.toString(0) + " » de la monnaie « " + from + " » invalide");
    convertAmounts([&](const Decimal& amount) { return devises.reprice(amount, fromRate, toRate, to); });
  }
  if (aBranche("CTRL_ACTUALISER_BASCULE")) executer("CTRL_ACTUALISER_BASCULE", e);
}

void Automate::ctrl_actualiser_bascule(Evt*) {}

void Automate::convertAmounts(const std::function<Decimal(const Decimal&)>& convert) {
  // Names first: a cursor made below joins the automaton's tables.
  std::vector<std::string> images;
  for (const Table* t : tables_)
    if (t->nom().rfind("MEM:", 0) == 0 && std::find(images.begin(), images.end(), t->nom()) == images.end())
      images.push_back(t->nom());
  for (const std::string& name : images) {
    // A cursor of its own on the image's rows, so that no binding of the screen
    // loses its buffer or position.
    Table image(this, "", name.c_str(), "CONVERSION");
    image.initRequete();
    image.activeRequete();
    for (int rc = image.suivant(3); rc == 0; rc = image.suivant(1)) {
      for (const Colonne& c : image.colonnes())
        if (c.genre == Genre::Monnaie) image.affecter(c.name, Valeur::montant(convert(image.valeur(c.name).decimal())));
      image.ecrit();
    }
  }
}

// ---------------------------------------------------------------------------- declarations

void Automate::keepState(Snapshot& snapshot) {
  for (Donnee* d : variables_) d->keepState(snapshot);
  for (Table* t : tables_) t->keepState(snapshot);
  snapshot.keep(screen_, error_code_, refused_, ended_);
}

void Automate::declarerVariable(Donnee* d) { variables_.push_back(d); }

void Automate::oublierVariable(Donnee* d) { std::erase(variables_, d); }

void Automate::declarerTable(Table* t) { tables_.push_back(t); }

void Automate::oublierTable(Table* t) { std::erase(tables_, t); }

Donnee* Automate::variable(std::string_view name) const {
  for (Donnee* d : variables_)
    if (d->nom() == name) return d;
  return nullptr;
}

Table* Automate::tableNommee(std::string_view alias) const {
  for (Table* t : tables_)
    if (t->alias() == alias) return t;
  return nullptr;
}

// ---------------------------------------------------------------------------- Univers, Message

std::string Univers::utilisateur() { return Session::courante().utilisateur(); }
std::string Univers::dossier() { return Session::courante().dossier(); }

void Message::nettoie(Automate* automate) { Session::courante().oublierMessages(automate); }

}  // namespace host
