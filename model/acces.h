// Access screens: a criteria form above a list of the main table's rows.
// Chain: Acces2 : Acces : Scritere : Traitecr : Traitbas.
//
// Start, in order: "INIT", "AVANT_DEBUT", "DEBUT" (any of them may leave through
// sortir, or be refused: the screen then leaves), then "ACTIVE_REQUETE" and the
// list is filled.
//
// The list "LST" shows the rows of the main table's request. Its base answer to
// "ACTIVE_REQUETE" (Scritere::active_requete) marks the list as out of date; the
// handler then sets the main table's filters and index, and the list is refilled
// once the user action is over (after the queued procedures): for each row of the
// request (suivant 3, then 1) "LST_SELECTION" runs with the main table's buffer on
// that row; a refused row is dropped, an accepted one is shown with a snapshot of
// the main table's fields and of the screen variables as the handler left them.
// Then "LST_LISTE_VIDE" or "LST_LISTE_PLEINE" runs, and the first row is selected.
//
// The list is read a page at a time, in index order: filling it reads the first page
// only, whatever the size of the request, and the rows after it are read when the
// user moves to them (readUntil, inside a user action), going on in the index from
// the last row read. A main table without a one-field key cannot be read again on
// a row, and its list is read whole.
// Selecting a row (selectRow) puts the main table's buffer on that row, so that
// the actions ("GERER", "CREER", ... branches run by name) act on it. When the
// screen comes back in front of the user (another screen closed), "DEBUT_ACTIVATION"
// runs (its base runs "ACTIVE_REQUETE") and the list is refilled.
#pragma once

#include <map>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "host/database.h"
#include "host/table.h"
#include "host/value.h"
#include "model/row_text.h"
#include "model/traitecr.h"

namespace model {

class Scritere : public Traitecr {
 public:
  explicit Scritere(Evt* e);

  // "ACTIVE_REQUETE": the base asks for every row of the main table and marks the
  // list out of date. A handler calls it first, then sets its own request.
  virtual void active_requete(Evt* e);

  // Refills the list if it is out of date (see above). The start cycle and every
  // user action on the screen (model/mains.h) call it inside their unit.
  void refreshList();
  bool listOutOfDate() const { return out_of_date_; }

  // Rows read so far, in list order; row(n) from 1. The text is made when asked
  // for: a list keeps each row's values packed, so that a long list stays small.
  std::size_t rowCount() const { return count_; }
  // Whether every row of the request has been read.
  bool complete() const { return complete_; }
  // Reads on until row n is read or the request ends; true when row n exists. Runs
  // "LST_SELECTION": only inside a user action.
  bool readUntil(std::size_t n);
  void readAll() { readUntil(static_cast<std::size_t>(-1)); }
  RowText row(int n) const;
  std::vector<RowText> rows() const;
  // Selects row n (from 1): the main table's buffer is read again on that row.
  // Throws HostError for a row the list does not show.
  void selectRow(int n);
  // Row selected (from 1), 0 when the list is empty.
  int selectedRow() const { return selected_; }

  void demarrer() override;
  void reactiver() override;
  void keepState(host::Snapshot& snapshot) override;

 protected:
  // Steps of the start before "ACTIVE_REQUETE" ("INIT", "AVANT_DEBUT", "DEBUT").
  virtual bool startSteps();

 private:
  // A row as filled: the main table's column values, then the variables' values,
  // each ended by a NUL (in the order of columns_ and variables_), and the key that
  // reads the row again when the table has a one-field primary key.
  struct Shown {
    std::string values;
    host::Valeur key;
  };
  // Rows in pages of kPage; every page but the last is full. A page is never
  // changed once read, so a failed action's snapshot shares them.
  static constexpr std::size_t kPage = 100;
  using Page = std::vector<Shown>;

  void fill();
  // Reads the next page of the request; false when a handler stopped the action.
  bool readPage();
  const Shown& shown(int n) const;
  void checkRow(int n) const;

  bool out_of_date_ = true;
  std::string alias_;                    // of the main table, at the last fill
  std::vector<host::Colonne> columns_;   // of the main table, at the last fill
  std::vector<std::string> variables_;   // names of the screen's variables, at the last fill
  int keyColumn_ = -1;                   // the one-field key among columns_, or -1
  std::vector<std::shared_ptr<const Page>> pages_;
  std::size_t count_ = 0;
  bool complete_ = true;
  // Where the request stands after the last row read, when the list goes on.
  std::optional<host::Table::Position> resume_;
  int selected_ = 0;
};

class Acces : public Scritere {
 public:
  explicit Acces(Evt* e);

  // "INIT": the base does nothing more than a free screen's.
  void init(Evt* e) override;
  // "AVANT_DEBUT": the base accepts.
  virtual void avant_debut(Evt* e);
  // "DEBUT_ACTIVATION": the screen is back in front; the base runs "ACTIVE_REQUETE".
  virtual void debut_activation(Evt* e);
  // The list's standard actions. Their base does nothing: each screen decides what
  // they open.
  virtual void creer(Evt* e);
  virtual void modifier(Evt* e);
  virtual void gerer(Evt* e);
  virtual void impr_fiche(Evt* e);
  virtual void impr_liste(Evt* e);

 protected:
  bool startSteps() override;
};

class Acces2 : public Acces {
 public:
  explicit Acces2(Evt* e);

  // "AVANT_DEBUT": the base of the access screens; a handler ends with it when its
  // own checks passed.
  void avant_debut(Evt* e) override;
};

}  // namespace model
