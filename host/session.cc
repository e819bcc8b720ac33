#include "host/session.h"

#include <algorithm>

#include "host/automate.h"
#include "host/currency.h"
#include "host/error.h"
#include "host/snapshot.h"

namespace host {

namespace {
thread_local Session* current = nullptr;

// An action that keeps finding the dossier changed under it by other processes
// gives up after this many starts, rather than trying for ever.
constexpr int kMaxBusyStarts = 20;

}  // namespace

bool estTableDeTravail(const std::string& name) {
  auto endsWith = [&](const std::string& suffix) {
    return name.size() >= suffix.size() && name.compare(name.size() - suffix.size(), suffix.size(), suffix) == 0;
  };
  return endsWith("_M01") || endsWith("_M02") || name == "MEM02" || name == "MEM04" || name.rfind("I_", 0) == 0;
}

// ---------------------------------------------------------------------------- Transcript

bool Transcript::ajouter(std::string sorte, std::string texte) {
  if (replay_at_ < replay_.size()) {
    const Entree& seen = replay_[replay_at_];
    if (seen.sorte == sorte && seen.texte == texte) {
      ++replay_at_;
      return false;
    }
    replay_.clear();
    replay_at_ = 0;
  }
  // The oldest half goes at once, so that keeping the bound costs one move per entry.
  if (entries_.size() >= 2 * kGardees) {
    entries_.erase(entries_.begin(), entries_.begin() + static_cast<std::ptrdiff_t>(kGardees));
    forgotten_ += kGardees;
  }
  entries_.push_back({std::move(sorte), std::move(texte)});
  return true;
}

std::vector<Entree> Transcript::depuis(std::size_t from) const {
  std::size_t first = from > forgotten_ ? from - forgotten_ : 0;
  if (first >= entries_.size()) return {};
  return {entries_.begin() + static_cast<std::ptrdiff_t>(first), entries_.end()};
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
  Steps steps = std::move(modal_.front());
  modal_.pop_front();
  played_.push_back(steps);
  steps(session, screen);
}

void ReponsesPreparees::actionRecommencee() {
  for (auto it = played_.rbegin(); it != played_.rend(); ++it) modal_.push_front(std::move(*it));
  played_.clear();
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

// What an action found, for putting it back when it fails or starts again.
struct Session::Attempt {
  Snapshot state;
  std::vector<Automate*> screens;
  std::set<std::string> libraries;
  std::size_t transcript_at = 0;
};

void Session::keep(Attempt& attempt) {
  for (const auto& screen : screens_) {
    attempt.screens.push_back(screen.get());
    screen->keepState(attempt.state);
  }
  for (const auto& [name, library] : libraries_) {
    attempt.libraries.insert(name);
    library->keepState(attempt.state);
  }
  if (devises_) devises_->keepState(attempt.state);
  attempt.transcript_at = transcript_.oubliees() + transcript_.entrees().size();
}

void Session::undo(Attempt& attempt, bool silent) {
  queue_.clear();
  attempt.state.restore();
  // Screens and libraries made during the action were made from what it undid.
  for (std::size_t i = screens_.size(); i-- > 0;) {
    Automate* screen = screens_[i].get();
    if (std::find(attempt.screens.begin(), attempt.screens.end(), screen) == attempt.screens.end())
      close(screen, silent);
  }
  std::erase_if(libraries_, [&](const auto& entry) { return !attempt.libraries.count(entry.first); });
}

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
  journal_.clear();
  agent_->actionCommencee();
  Database::Verrou lock = Database::Verrou::differe;
  for (int busy_starts = 0;;) {
    Attempt attempt;
    keep(attempt);
    journal_at_ = 0;
    pending_ = nullptr;
    failed_ = false;
    bool again = false;
    ++action_depth_;
    try {
      db_->begin(lock, Database::Sync::whenAsked);
      act();
      executerFile();
      // Work a library began in the action and left unfinished ends with it.
      if (!failed_)
        for (auto& [name, library] : libraries_) library->endOfUnit();
    } catch (const UniteARecommencer&) {
      again = true;
    } catch (const std::exception& e) {
      signalerErreur("", e.what());
    }
    --action_depth_;
    if (!again && !failed_) {
      try {
        db_->commit();
        endAttempt(true);
        break;
      } catch (const Database::NonGarde& e) {
        signalerErreur("", e.what());
        break;
      } catch (const std::exception& e) {
        signalerErreur("", e.what());
      }
    }
    db_->rollback();
    endAttempt(false);
    undo(attempt, again);
    if (!again) break;
    if (pending_) {
      // The question that came once the action had written is asked now that the
      // dossier is free; the action then starts again with its answer.
      try {
        auto asking = std::move(pending_);
        asking();
      } catch (const std::exception& e) {
        signalerErreur("", e.what());
        break;
      }
    } else if (++busy_starts == kMaxBusyStarts) {
      signalerErreur("", "d'autres utilisateurs modifient le dossier sans relâche : l'action n'a pu aboutir, rien "
                         "n'est enregistré ; réessayez dans un instant");
      break;
    } else {
      // Another process wrote: this time the action waits for the write lock first.
      lock = Database::Verrou::immediat;
    }
    transcript_.rejouer(transcript_.depuis(attempt.transcript_at));
    agent_->actionRecommencee();
  }
  transcript_.rejouer({});
  fermerTermines();
  return !failed_;
}

void Session::aLaFinDeLAction(std::function<void(bool committed)> done) {
  if (action_depth_ == 0)
    done(true);
  else
    at_end_.push_back(std::move(done));
}

void Session::endAttempt(bool committed) {
  std::vector<std::function<void(bool)>> done = std::move(at_end_);
  at_end_.clear();
  for (auto& d : done) {
    try {
      d(committed);
    } catch (const std::exception& e) {
      signalerErreur("", e.what());
    }
  }
}

void Session::dansUnite(const std::function<void()>& act) {
  if (action_depth_ > 0)
    act();
  else
    action(act);
}

void Session::signalerErreur(const std::string& event, const std::string& message) {
  failed_ = true;
  if (transcript_.ajouter("erreur", event.empty() ? message : event + " : " + message)) agent_->message(message);
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

void Session::close(Automate* automate, bool silent) {
  auto it = std::find_if(screens_.begin(), screens_.end(), [&](const AutomatePtr& p) { return p.get() == automate; });
  if (it == screens_.end()) return;
  forgetQueued(automate);
  if (!silent) transcript_.ajouter("ferme", automate->code());
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
  if (transcript_.ajouter("message", text)) agent_->message(text);
}

std::optional<std::string> Session::answered(const std::string& kind, const std::string& text) {
  if (journal_at_ >= journal_.size()) return std::nullopt;
  const Answered& known = journal_[journal_at_];
  if (known.kind != kind || known.text != text) {
    // The action took another road this time: the answers that follow were to
    // questions of the road it left.
    journal_.resize(journal_at_);
    return std::nullopt;
  }
  ++journal_at_;
  return known.answer;
}

std::string Session::ask(const std::string& kind, const std::string& text, std::function<std::string()> ask) {
  if (std::optional<std::string> known = answered(kind, text)) {
    transcript_.ajouter(kind, text);
    transcript_.ajouter("réponse", *known);
    return *known;
  }
  auto put = [this, kind, text, ask = std::move(ask)] {
    transcript_.ajouter(kind, text);
    std::string answer = ask();
    transcript_.ajouter("réponse", answer);
    journal_.push_back({kind, text, answer});
    journal_at_ = journal_.size();
    return answer;
  };
  if (action_depth_ > 0 && db_->ecritureEnCours()) {
    // Nobody waits for a person while this unit holds the dossier.
    pending_ = [put] { put(); };
    throw UniteARecommencer{};
  }
  return put();
}

bool Session::demander(const std::string& question) {
  return ask("question", question, [this, question] { return std::string(agent_->oui(question) ? "oui" : "non"); }) ==
         "oui";
}

std::string Session::dialoguer(const std::string& title, const std::string& text,
                               const std::vector<std::string>& choices) {
  std::string shown = title + " : " + text;
  for (const auto& c : choices) shown += " | " + c;
  return ask("dialogue", shown, [this, title, text, choices] {
    std::string code = agent_->dialogue(title, text, choices);
    bool known =
        std::any_of(choices.begin(), choices.end(), [&](const std::string& c) { return c.rfind(code, 0) == 0; });
    if (code.empty() || !known) throw HostError("réponse « " + code + " » hors des choix du dialogue « " + text + " »");
    return code;
  });
}

std::optional<std::string> Session::choisir(const std::string& window, const std::vector<std::string>& rows) {
  // A cancelled choice is kept as the text the transcript shows for it; no row of a
  // choice window (accounts, codes, currencies) has that key.
  static const std::string kCancelled = "(abandon)";
  std::string answer = ask("choix", window, [this, window, rows] {
    std::optional<std::string> pick = agent_->choisir(window, rows);
    return pick ? *pick : kCancelled;
  });
  if (answer == kCancelled) return std::nullopt;
  return answer;
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
