// The user's session: one process working on one dossier for one user.
//
// The session holds the database connection, the work tables private to the
// user, the screens that are open, the queue of procedures handed back to the
// host, the user port and the transcript of what the user saw.
//
// One user action is one unit (action()): it begins a unit of work, runs the
// handler, then the queued procedures in order, and commits. When a handler
// raised a host error, or anything else escaped, the unit is rolled back whole and
// the session is put back as the action found it (every automaton's variables,
// buffers, lists and screen state, the currency service): a killed process or a
// failed action never leaves half its writes behind, in the dossier or on screen.
//
// A unit takes no lock while it only reads, and never holds the dossier's write
// lock while a person thinks: a question that comes once the action has written is
// asked after the unit is rolled back, and the action is then played again from its
// start, the answers already given taken from the session's journal instead of being
// asked twice. The same happens when another process wrote the dossier after the
// action began reading. What the user already saw is not shown twice.
#pragma once

#include <deque>
#include <functional>
#include <map>
#include <memory>
#include <optional>
#include <set>
#include <string>
#include <vector>

#include "host/database.h"
#include "host/screen.h"
#include "host/registry.h"

namespace host {

class Automate;
class Devises;

// Work tables belong to the user's session: names ending in "_M01" or "_M02",
// "MEM02", "MEM04", and the "I_" tables that reading procedures fill.
bool estTableDeTravail(const std::string& name);
class Session;

// What the user saw and did, in order. Kinds: "ouvre", "ferme", "message",
// "question", "réponse", "dialogue", "choix", "refus", "erreur", "saisie", "action".
struct Entree {
  std::string sorte;
  std::string texte;
};

// The transcript keeps the most recent entries only (at least kGardees): a session
// that posts an import of a hundred thousand invoices must not grow with it. Entries
// are numbered from the session's first one, so a reader that noted where it stopped
// (oubliees() + entrees().size()) finds its place again after older entries went.
class Transcript {
 public:
  static constexpr std::size_t kGardees = 10000;

  // Adds an entry; false when it repeats what an action played again already
  // showed (see rejouer), which is then not added.
  bool ajouter(std::string sorte, std::string texte);
  // The entries kept, oldest first; the first one is number oubliees().
  const std::vector<Entree>& entrees() const { return entries_; }
  // How many entries went before the ones kept (dropped, or emptied by vider()).
  std::size_t oubliees() const { return forgotten_; }
  // Texts of one kind, in order.
  std::vector<std::string> textes(const std::string& sorte) const;
  std::string rendu() const;  // one line an entry, for people
  void vider() {
    forgotten_ += entries_.size();
    entries_.clear();
  }
  // The entries from number `from` on (as far as they are kept).
  std::vector<Entree> depuis(std::size_t from) const;
  // An action is played again: the entries it adds are dropped as long as they are
  // the ones `seen` already holds, in order; the first that differs ends that.
  void rejouer(std::vector<Entree> seen) {
    replay_ = std::move(seen);
    replay_at_ = 0;
  }

 private:
  std::vector<Entree> entries_;
  std::size_t forgotten_ = 0;
  std::vector<Entree> replay_;
  std::size_t replay_at_ = 0;
};

// The user. Screens never block on a terminal: every question comes here.
class UserAgent {
 public:
  virtual ~UserAgent() = default;
  virtual void message(const std::string& text) { (void)text; }
  // A yes/no question; true for yes.
  virtual bool oui(const std::string& question) = 0;
  // A dialog; returns the answer code of the chosen choice.
  virtual std::string dialogue(const std::string& title, const std::string& text,
                               const std::vector<std::string>& choices) = 0;
  // A choice window over rows; returns the picked row's key, or nothing (cancelled).
  virtual std::optional<std::string> choisir(const std::string& window, const std::vector<std::string>& rows) = 0;
  // Acts on a modal screen until it is closed (or there is nothing more to do).
  virtual void piloter(Session& session, Automate& screen) = 0;
  // A user action begins; it is played again from its start (what the user did on
  // modal screens since it began will be asked for again).
  virtual void actionCommencee() {}
  virtual void actionRecommencee() {}
  // After each user action, what an open screen has to show again (Ecran::Dessin):
  // a front end draws it; the others let it go.
  virtual void dessiner(Automate& screen, Ecran::Dessin dessin) { (void)screen, (void)dessin; }
};

// Answers given in advance, in order. A question with no answer left is an
// error (HostError naming the question), never a silent default.
class ReponsesPreparees : public UserAgent {
 public:
  void ajouterOui(bool yes) { yes_no_.push_back(yes); }
  void ajouterDialogue(std::string code) { dialogs_.push_back(std::move(code)); }
  void ajouterChoix(std::optional<std::string> pick) { picks_.push_back(std::move(pick)); }
  // Steps run on a modal screen, in order.
  void ajouterPilotage(std::function<void(Session&, Automate&)> steps) { modal_.push_back(std::move(steps)); }

  bool oui(const std::string& question) override;
  std::string dialogue(const std::string& title, const std::string& text,
                       const std::vector<std::string>& choices) override;
  std::optional<std::string> choisir(const std::string& window, const std::vector<std::string>& rows) override;
  void piloter(Session& session, Automate& screen) override;
  void actionCommencee() override { played_.clear(); }
  void actionRecommencee() override;
  // Keeps the last drawing handed over, for a test to look at.
  void dessiner(Automate&, Ecran::Dessin dessin) override { dernierDessin = std::move(dessin); }
  Ecran::Dessin dernierDessin;

 private:
  using Steps = std::function<void(Session&, Automate&)>;
  std::deque<bool> yes_no_;
  std::deque<std::string> dialogs_;
  std::deque<std::optional<std::string>> picks_;
  std::deque<Steps> modal_;
  std::vector<Steps> played_;  // modal steps played since the action began
};

class Session {
 public:
  Session(std::unique_ptr<Database> db, UserAgent& agent, std::string user);
  ~Session();
  Session(const Session&) = delete;
  Session& operator=(const Session&) = delete;

  // The session of this process; throws HostError when none is open.
  static Session& courante();
  static bool existe();

  Database& base() { return *db_; }
  Transcript& transcript() { return transcript_; }
  UserAgent& agent() { return *agent_; }
  void setAgent(UserAgent& agent) { agent_ = &agent; }
  const std::string& utilisateur() const { return user_; }
  std::string dossier() const { return db_->chemin(); }

  // ---- user actions
  // Runs one user action as one unit. Returns false when it failed and was undone.
  bool action(const std::function<void()>& act);
  // Runs `act` inside the unit of the action under way, or as its own action.
  void dansUnite(const std::function<void()>& act);
  void signalerErreur(const std::string& event, const std::string& message);
  bool actionEchouee() const { return failed_; }
  // Work that must land with the user action under way, not with one of its attempts
  // (a file written for the user): `done(true)` runs once the action has committed,
  // `done(false)` when its attempt is rolled back (and the action perhaps played
  // again). Outside an action, `done(true)` runs at once.
  void aLaFinDeLAction(std::function<void(bool committed)> done);

  // ---- screens and modules
  // Opens a module beside its caller and returns at once.
  Automate* ouvrir(AutomatePtr automate);
  // Runs a module to its end (a screen runs its own loop of user actions).
  void executer(AutomatePtr automate);
  // Screens open, oldest first.
  std::vector<Automate*> ecrans() const;
  Automate* ecranCourant() const;
  Automate* ecran(const std::string& code) const;
  // Closes the screens that left (sortir); the one now in front is reactivated.
  void fermerTermines();
  void fermerTout();

  // The instance of a procedure library ("CPMESSAG-INTERFACE") for this session.
  Automate& bibliotheque(const std::string& name);

  // ---- queued procedures
  void enfiler(Automate* automate, std::string procedure);
  void executerFile();

  // ---- user port, with the transcript
  void montrer(const std::string& text);
  bool demander(const std::string& question);
  std::string dialoguer(const std::string& title, const std::string& text, const std::vector<std::string>& choices);
  std::optional<std::string> choisir(const std::string& window, const std::vector<std::string>& rows);
  void oublierMessages(Automate* automate);

  // ---- label tables
  std::string libelle(const std::vector<std::string>& tables, std::string_view code);

  // ---- work tables: the session's private copy, made on first use
  void tableDeTravail(const std::string& name);

  // The currency service of the session (host/currency.h); host::euro() makes it.
  std::shared_ptr<Devises>& devises() { return devises_; }

 private:
  struct Queued {
    Automate* automate;
    std::string procedure;
  };
  // A question answered during the action under way, kept for when it is played again.
  struct Answered {
    std::string kind, text, answer;
  };
  struct Attempt;
  void forgetQueued(Automate* automate);
  void close(Automate* automate, bool silent = false);
  void keep(Attempt& attempt);
  void endAttempt(bool committed);
  void undo(Attempt& attempt, bool silent);
  // The answer of the journal for this question, when the action played again has
  // come to it.
  std::optional<std::string> answered(const std::string& kind, const std::string& text);
  // Asks through `ask`, unless the unit holds the write lock: the question is then
  // kept for once the unit is rolled back, and the action starts again.
  std::string ask(const std::string& kind, const std::string& text, std::function<std::string()> ask);

  std::unique_ptr<Database> db_;
  UserAgent* agent_;
  std::string user_;
  Transcript transcript_;
  std::vector<AutomatePtr> screens_;
  std::map<std::string, AutomatePtr> libraries_;
  std::deque<Queued> queue_;
  std::set<std::string> work_tables_;
  int action_depth_ = 0;
  bool failed_ = false;
  std::vector<Answered> journal_;
  std::size_t journal_at_ = 0;
  std::function<void()> pending_;  // a question to ask once the unit is rolled back
  std::vector<std::function<void(bool)>> at_end_;  // of the attempt under way
  Session* previous_;
  std::shared_ptr<Devises> devises_;
};

}  // namespace host
