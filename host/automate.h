// The automaton: the base of every screen, process, print job and service.
//
// An automaton declares its variables, tables and fields in its constructor, then
// its branch table (addBranch): event or procedure name -> handler. The host runs
// a branch by name (executer); the model library adds its own answers to the
// standard events of each kind (addBaseBranch), which a branch of the same name
// replaces. Every branch runs inside a trap: a HostError raised in it is stamped
// with the branch's name and handed to exception(), which reports it and marks the
// user action failed so that nothing it wrote is kept.
//
// Calls by name go through the session (session.h): procedures of another
// library run on one instance of that library module per session; modules called
// with appelerModule run to their end; modules opened with lancerModule stay open
// beside their caller; branches queued with lancerProcedure run once the current
// user action's handlers have all returned, in the order they were queued.
#pragma once

#include <functional>
#include <map>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "host/event.h"
#include "host/screen.h"
#include "host/value.h"

namespace host {

class Session;
class Snapshot;
class Table;

class Automate {
 public:
  using Handler = std::function<void(Evt*)>;

  explicit Automate(Evt* lancement);
  Automate(const Automate&) = delete;
  Automate& operator=(const Automate&) = delete;
  virtual ~Automate();

  // Registry name of the module ("MIRVAE-ACCES1"), set by the host at creation.
  const std::string& code() const { return code_; }
  void setCode(std::string code) { code_ = std::move(code); }
  // The event the automaton was created with (never null).
  Evt* lancement() const { return launch_; }

  // ---- branch table
  template <class T>
  void addBranch(const char* name, void (T::*handler)(Evt*)) {
    addBranch(std::string(name), Handler([this, handler](Evt* e) { (static_cast<T*>(this)->*handler)(e); }));
  }
  void addBranch(std::string name, Handler handler);
  // Names in registration order.
  const std::vector<std::string>& branches() const { return branch_order_; }
  bool aBranche(std::string_view name) const;
  // Runs a branch by name, own branch first, then the model's; throws HostError for
  // a name that neither knows. A null event runs with an empty one.
  void executer(std::string_view name, Evt* e);

  // ---- calls by name
  void appelerProcedure(const char* base, const char* source, const char* module, const char* procedure, Evt* e,
                        int flag);
  void lancerProcedure(const char* base, const char* source, const char* module, const char* procedure, Evt* e,
                       int flag);
  void appelerModule(const char* base, const char* source, const char* module, Evt* e);
  // Takes ownership of `e`, which must come from new.
  void lancerModule(const char* base, const char* source, const char* module, Evt* e);

  // ---- results, refusals, end
  void erreurMethode(int code, Evt* e) { (void)e; error_code_ = code; }
  int erreurMethode() const { return error_code_; }
  void rejeter(Evt* e);
  bool refuse() const { return refused_; }
  void oublierRefus() { refused_ = false; }
  void sortir(Evt* e, int code);
  bool estTermine() const { return ended_; }
  void controler(const char* field, const char* unused);
  void exception(Evt* e);

  // ---- user port
  std::string libelle(std::string_view code);
  void BoiteMessage(std::string_view text, int kind, void* unused);
  // Shows a dialog; each choice starts with its answer code ("1~Enregistrer").
  // Returns the code of the chosen one.
  std::string BoiteDialogue(std::string_view title, std::string_view text, int icon,
                            const std::vector<std::string>& choices);

  // ---- identity
  void nomBase(const char* base) { base_ = base ? base : ""; }
  void nomLibelles(const char* first, const char* second);
  void nomTable(const char* name, void* unused);
  const std::string& nomBase() const { return base_; }
  const std::vector<std::string>& nomLibelles() const { return label_tables_; }
  const std::string& nomTable() const { return main_table_name_; }
  // Source (library) name of the module: "MIRVAE" for "MIRVAE-ACCES1".
  std::string nomSource() const;

  // Main table binding (exists from construction; named by nomTable).
  Table* table(bool unused);
  Ecran* ecran() { return &screen_; }
  const Ecran* ecran() const { return &screen_; }
  template <typename... Names>
  void cacher(Names... names) { screen_.cacher(names...); }
  template <typename... Names>
  void montrer(Names... names) { screen_.montrer(names...); }

  // ---- standard events that every automaton answers
  virtual void debut(Evt* e);
  virtual void selection_tri(Evt* e);
  virtual void ctrl_defaut_colonne(Evt* e);
  // The currency switch. Parameters: currency code, date of the rate, rate (zero for
  // the rate of that day), option letters. Runs the automaton's branch
  // "CTRL_ACTUALISER_MODE", which makes the currency the service's current one or
  // refuses (method result 1: nothing changes and the switch stops). When the current
  // currency changed and the options hold no "D" (the document's amounts are not
  // already in the new currency), the document's amounts are converted
  // (convertAmounts). Then runs the branch "CTRL_ACTUALISER_BASCULE". A branch the
  // automaton does not answer is skipped.
  virtual void ctrl_basculer(Evt* e);
  // After a switch; the base does nothing.
  virtual void ctrl_actualiser_bascule(Evt* e);
  // Converts the amounts of the document in front with `convert` (from the old
  // currency at its rate to the new one at its rate, rounded to its decimals). The
  // base converts every money column of every row of the automaton's memory images;
  // a screen that keeps amounts of its document elsewhere converts those too.
  virtual void convertAmounts(const std::function<Decimal(const Decimal&)>& convert);

  // ---- lifecycle, driven by the session through the model library
  // Runs the kind's start cycle (a process runs to its end here).
  virtual void demarrer() {}
  // A screen waits for user actions once started; a process does not.
  virtual bool estEcran() const { return false; }
  // Runs when the screen comes back in front of the user.
  virtual void reactiver() {}

  // ---- declarations, found by name (scripts type into variables and fields)
  void declarerVariable(Donnee* d);
  void oublierVariable(Donnee* d);
  void declarerTable(Table* t);
  void oublierTable(Table* t);
  Donnee* variable(std::string_view name) const;
  Table* tableNommee(std::string_view alias) const;
  const std::vector<Donnee*>& variables() const { return variables_; }
  const std::vector<Table*>& tables() const { return tables_; }

  Session& session() const;

  // Keeps what a user action may change in this automaton (variables, tables, screen
  // state, results) so that a failed action can put it back. A class that keeps state
  // in members of its own adds them, after its base's.
  virtual void keepState(Snapshot& snapshot);
  // Runs for each procedure library of the session before the user action's unit
  // commits: a library ends there what the action began and left unfinished. The
  // base does nothing.
  virtual void endOfUnit() {}

 protected:
  // The model library's answer to a standard event; an own branch of the same
  // name replaces it.
  void addBaseBranch(std::string name, Handler handler);

 private:
  std::string code_;
  Evt* launch_;
  std::unique_ptr<Evt> empty_launch_;
  std::map<std::string, Handler, std::less<>> branches_, base_branches_;
  std::vector<std::string> branch_order_;
  int error_code_ = 0;
  bool refused_ = false;
  bool ended_ = false;
  std::string base_, main_table_name_;
  std::vector<std::string> label_tables_;
  std::vector<Donnee*> variables_;
  std::vector<Table*> tables_;
  std::unique_ptr<Table> main_table_;
  Ecran screen_;
  Session* session_;
};

// The user's name and the dossier of the running session.
struct Univers {
  static std::string utilisateur();
  static std::string dossier();
};

namespace Message {
// Drops the messages the automaton still had to show.
void nettoie(Automate* automate);
}  // namespace Message

}  // namespace host
