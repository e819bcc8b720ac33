// Free screens (Traitecr): a screen with its own objects and no standard list.
//
// Start: "INIT", then "DEBUT"; a handler that leaves (sortir) stops the start.
// The screen then waits for user actions (model/mains.h): each one sets a value
// or presses an action, and runs the branch of that name. Before a value is typed
// into a control, "CTRL_DEBUT_MODIF" runs for it (the control enters modification);
// its base accepts, and a refusal refuses the input. A start step that is
// refused or fails makes the screen leave.
//
// Cycles run inside the user action that opened the screen (see model/mains.h):
// what the start writes lands with that action or not at all.
#pragma once

#include <string>
#include <vector>

#include "model/row_text.h"
#include "model/traitmnt.h"

namespace model {

class Traitecr : public Traitbas {
 public:
  explicit Traitecr(Evt* e);

  // Name of the screen description ("+GEST_JUS"); kept, not drawn.
  void nomEcran(const char* name) { screen_name_ = name ? name : ""; }
  const std::string& nomEcran() const { return screen_name_; }

  // "INIT": the base does nothing.
  virtual void init(Evt* e);
  // "CTRL_DEBUT_MODIF": a control is about to be modified. The base accepts.
  virtual void ctrl_debut_modif(Evt* e);

  bool estEcran() const override { return true; }
  void demarrer() override;

 private:
  std::string screen_name_;
};

// A free screen that shows one list of rows (the justification's due dates). Its
// columns are reached as "<list>_<TABLE>.<FIELD>" ("LST_MIRVAJUS_M02.MTREGS"): the
// value typed goes into the record of the current row, and the branch of that full
// name runs; the screen writes the row back.
class FreeList {
 public:
  virtual ~FreeList() = default;
  // The list's name ("LST").
  virtual std::string listName() const = 0;
  // The rows, in list order.
  virtual std::vector<RowText> rows() = 0;
  // Makes row n (from 1) current; false when the screen refuses.
  virtual bool goToRow(int n) = 0;
};

}  // namespace model
