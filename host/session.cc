#include "host/session.h"

#include <algorithm>

#include "host/automate.h"
#include "host/error.h"

namespace host {

namespace {
thread_local Session* current = nullptr;

}  // namespace

bool estTableDeTravail(const std::string& name) {
  auto endsWith = [&](const std::string& suffix) {
    return name.size() >= suffix.size() && name.compare(name.size() - suffix.size(), suffix.size(), suffix) == 0;
  };
  return endsWith("_M01") || endsWith("_M02") || name == "MEM02" || name == "MEM04" || name.rfind("I_", 0) == 0;
}

// ---------------------------------------------------------------------------- Transcript

void Transcript::ajouter(std::string sorte, std::string texte) {
  // The oldest half goes at once, so that keeping the bound costs one move per entry.
  if (entries_.size() >= 2 * kGardees) {
    entries_.erase(entries_.begin(), entries_.begin() + static_cast<std::ptrdiff_t>(kGardees));
    forgotten_ += kGardees;
  }
  entries_.push_back({std::move(sorte), std::move(texte)});
}

std::vector<std::string> Transcript::textes(const std::string& sorte) const {
  std::vector<std::string> out;
  for (const auto& e : entries_)
    if (e.sorte == sorte) out.push_back(e.texte);
  return out;
}

std::string Transcript::rendu() const {
  std::string out;
  for (const auto& e : entries_) {
    std::string text = e.texte;
    // "@" starts a new line in the system's messages.
    std::replace(text.begin(), text.end(), '@', '\n');
    std::string indent = "\n" + std::string(e.sorte.size() + 3, ' ');
    std::size_t at = 0;
    while ((at = text.find('\n', at)) != std::string::npos) {
      text.replace(at, 1, indent);
      at += indent.size();
    }
    out += "[" + e.sorte + "] " + text + "\n";
  }
  return out;
}

// ---------------------------------------------------------------------------- ReponsesPreparees

bool ReponsesPreparees::oui(const std::string& question) {
  if (yes_no_.empty()) throw HostError("aucune réponse prévue à la question « " + question + " »");
  bool yes = yes_no_.front();
  yes_no_.pop_front();
  return yes;
}

std::string ReponsesPreparees::dialogue(const std::string&, const std::string& text, const std::vector<std::string>&) {
  if (dialogs_.empty()) throw HostError("aucune réponse prévue au dialogue « " + text + " »");
  std::string code = dialogs_.front();
  dialogs_.pop_front();
  return code;
}

std::optional<std::string> ReponsesPreparees::choisir(const std::string& window, const std::vector<std::string>&) {
  if (picks_.empty()) throw HostError("aucun choix prévu dans la fenêtre « " + window + " »");
  auto pick = picks_.front();
  picks_.pop_front();
  return pick;
}

void ReponsesPreparees::piloter(Session& session, Automate& screen) {
  if (modal_.empty()) return;
  auto steps = std::move(modal_.front());
  modal_.pop_front();
  steps(session, screen);
}

// ---------------------------------------------------------------------------- Session

Session::Session(std::unique_ptr<Database> db, UserAgent& agent, std::string user)
    : db_(std::move(db)), agent_(&agent), user_(std::move(user)), previous_(current) {
  current = this;
  Statement& s = db_->prepare("SELECT name FROM main.sqlite_schema WHERE type = 'table'");
  std::vector<std::string> names;
  while (s.step()) names.push_back(s.text(0));
  s.reset();
  for (const auto& name : names)
    if (estTableDeTravail(name)) {
      db_->creerCopiePrivee(name, name);
      work_tables_.insert(name);
    }
}

Session::~Session() {
  screens_.clear();
  libraries_.clear();
  if (db_->profondeur() > 0) db_->rollback();
  current = previous_;
}

Session& Session::courante() {
  if (!current) throw HostError("aucune session ouverte");
  return *current;
}

bool Session::existe() { return current != nullptr; }

void Session::tableDeTravail(const std::string& name) {
  if (work_tables_.count(name)) return;
  db_->creerCopiePrivee(name, name);
  work_tables_.insert(name);
}

// ---------------------------------------------------------------------------- actions

bool Session::action(const std::function<void()>& act) {
  if (action_depth_ > 0) {
    // An action played inside another (a modal screen's) belongs to its unit: its
    // failure undoes the whole unit, but it answers for itself only.
    bool failed_before = failed_;
    failed_ = false;
    act();
    bool ok = !failed_;
    failed_ = failed_ || failed_before;
    return ok;
  }
  ++action_depth_;
  failed_ = false;
  db_->begin();
  try {
    act();
    executerFile();
  } catch (const std::exception& e) {
    signalerErreur("", e.what());
  }
  --action_depth_;
  if (failed_) {
    queue_.clear();
    db_->rollback();
  } else {
    try {
      db_->commit();
    } catch (const std::exception& e) {
      signalerErreur("", e.what());
      db_->rollback();
    }
  }
  fermerTermines();
  return !failed_;
}

void Session::dansUnite(const std::function<void()>& act) {
  if (action_depth_ > 0)
    act();
  else
    action(act);
}

void Session::signalerErreur(const std::string& event, const std::string& message) {
  failed_ = true;
  transcript_.ajouter("erreur", event.empty() ? message : event + " : " + message);
  agent_->message(message);
}

// ---------------------------------------------------------------------------- screens and modules

Automate* Session::ouvrir(AutomatePtr automate) {
  Automate* raw = automate.get();
  transcript_.ajouter("ouvre", raw->code());
  screens_.push_back(std::move(automate));
  raw->demarrer();
  if (raw->estTermine() || !raw->estEcran()) close(raw);
  return raw;
}

void Session::executer(AutomatePtr automate) {
  Automate* raw = automate.get();
  transcript_.ajouter("ouvre", raw->code());
  screens_.push_back(std::move(automate));
  raw->demarrer();
  if (raw->estEcran() && !raw->estTermine()) agent_->piloter(*this, *raw);
  close(raw);
}

void Session::close(Automate* automate) {
  auto it = std::find_if(screens_.begin(), screens_.end(), [&](const AutomatePtr& p) { return p.get() == automate; });
  if (it == screens_.end()) return;
  forgetQueued(automate);
  transcript_.ajouter("ferme", automate->code());
  AutomatePtr owned = std::move(*it);
  screens_.erase(it);
}

std::vector<Automate*> Session::ecrans() const {
  std::vector<Automate*> out;
  for (const auto& s : screens_) out.push_back(s.get());
  return out;
}

Automate* Session::ecranCourant() const { return screens_.empty() ? nullptr : screens_.back().get(); }

Automate* Session::ecran(const std::string& code) const {
  for (auto it = screens_.rbegin(); it != screens_.rend(); ++it)
    if ((*it)->code() == code) return it->get();
  return nullptr;
}

void Session::fermerTermines() {
  Automate* front = ecranCourant();
  bool closed = false;
  for (;;) {
    auto it = std::find_if(screens_.begin(), screens_.end(), [](const AutomatePtr& p) { return p->estTermine(); });
    if (it == screens_.end()) break;
    close(it->get());
    closed = true;
  }
  Automate* now = ecranCourant();
  if (closed && now && now != front) action([now] { now->reactiver(); });
}

void Session::fermerTout() {
  while (!screens_.empty()) close(screens_.back().get());
}

Automate& Session::bibliotheque(const std::string& name) {
  auto it = libraries_.find(name);
  if (it != libraries_.end()) return *it->second;
  AutomatePtr automate = Registre::instance().creer(name, nullptr);
  Automate& ref = *automate;
  libraries_.emplace(name, std::move(automate));
  return ref;
}

// ---------------------------------------------------------------------------- queue

void Session::enfiler(Automate* automate, std::string procedure) { queue_.push_back({automate, std::move(procedure)}); }

void Session::executerFile() {
  while (!queue_.empty()) {
    Queued next = queue_.front();
    queue_.pop_front();
    next.automate->executer(next.procedure, nullptr);
  }
}

void Session::forgetQueued(Automate* automate) {
  std::erase_if(queue_, [&](const Queued& q) { return q.automate == automate; });
}

// ---------------------------------------------------------------------------- user port

void Session::montrer(const std::string& text) {
  transcript_.ajouter("message", text);
  agent_->message(text);
}

bool Session::demander(const std::string& question) {
  transcript_.ajouter("question", question);
  bool yes = agent_->oui(question);
  transcript_.ajouter("réponse", yes ? "oui" : "non");
  return yes;
}

std::string Session::dialoguer(const std::string& title, const std::string& text,
                               const std::vector<std::string>& choices) {
  std::string shown = title + " : " + text;
  for (const auto& c : choices) shown += " | " + c;
  transcript_.ajouter("dialogue", shown);
  std::string code = agent_->dialogue(title, text, choices);
  bool known = std::any_of(choices.begin(), choices.end(), [&](const std::string& c) { return c.rfind(code, 0) == 0; });
  if (code.empty() || !known) throw HostError("réponse « " + code + " » hors des choix du dialogue « " + text + " »");
  transcript_.ajouter("réponse", code);
  return code;
}

std::optional<std::string> Session::choisir(const std::string& window, const std::vector<std::string>& rows) {
  transcript_.ajouter("choix", window);
  auto pick = agent_->choisir(window, rows);
  transcript_.ajouter("réponse", pick ? *pick : "(abandon)");
  return pick;
}

void Session::oublierMessages(Automate*) {
  // Messages are shown as they come; none is ever left pending.
}

std::string Session::libelle(const std::vector<std::string>& tables, std::string_view code) {
  for (const auto& table : tables) {
    if (!db_->existe(table)) continue;
    Statement& s = db_->prepare("SELECT TEXTE FROM " + quoteIdent(table) + " WHERE CODE = ?");
    s.bind(1, code);
    if (s.step()) {
      std::string text = s.text(0);
      s.reset();
      return text;
    }
    s.reset();
  }
  throw HostError("libellé « " + std::string(code) + " » introuvable");
}

}  // namespace host
