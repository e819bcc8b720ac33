// Entry documents, the header side: AutomTab (an automaton over its main table),
// Saisie (modes, opening, creation, saving and deleting the header) and Setape
// (the modification request and the validation cycle). Lines are Sdocum's
// (model/sdocum.h); Gestion_document2 (model/gestion_document.h) is the base the
// entry screens derive from.
//
// Mode string (modeSaisie): the upper-case letters are the modes allowed, "C"
// creation, "M" modification, "V" visualisation, "A" deletion; a final lower-case
// letter is the start mode ("VMCAv", "VMCAm", "VMCAc", "Vv"). An empty string allows
// every mode and starts in visualisation when an identifier is given, in creation
// otherwise.
//
// Start, in order: "INIT", "AVANT_DEBUT", "DEBUT" (a refusal, a failure or sortir
// makes the screen leave). Then:
//   - with an identifier (first launch parameter, not empty) and a start mode other
//     than creation: the header is read from the main table by its key IDENT and
//     offered to "SELECTION_TRI"; a missing or refused header is not shown (a
//     message says so) and the screen leaves. The lines are loaded, with
//     "EXTRACTION_DONNEES" per line, then "DEBUT_FICHE". Start mode "m" then runs
//     "MODIFICATION" (the request, whose base switches to modification and runs
//     "DEBUT_MODIFICATION"); "v" runs "DEBUT_VISUALISATION".
//   - otherwise "CREATION": blank header, no lines, "DEBUT_CREATION",
//     "DEBUT_FICHE", "APRES_DEBUT_CREATION".
// When a handler asks for visualisation (Ecran::toVisu) of a document in
// modification, the document switches to it ("DEBUT_VISUALISATION") once the start
// or the user action is over.
//
// Validation ("VALID_DOC", base Setape::valid_doc): a line still in entry is
// validated first; then "VALIDATION". Its base (Saisie::validation), which a
// handler calls once its checks passed, saves: the header (a new one gets its
// IDENT, 8 characters, from the NDOC counter named after the main table,
// "MIRVAE"), then the lines (see
// Sdocum). A refusal before the base saves nothing. Once saved: "APRES_VALIDATION",
// and the lines are read again as saved. For a creation then "FIN_CREATION" and
// "DIALOGUE" with TYPE "VA_CREAT", which asks whether to go on creating: REPONSE 1
// starts a new creation ("CREATION"); 0 leaves the saved document on screen in
// visualisation (or closes the screen when visualisation is not allowed). A
// modification stays in modification.
//
// Deletion ("SUPPRESSION", allowed by "A"): "AVANT_SUPPRESSION", whose base
// (Saisie::avant_suppression) allows it; then, per saved line,
// "SUPPRESSION_DONNEES" and the line's deletion, the header's deletion, and the
// screen leaves. Abandon ("ABAND_DOC"): the changes since the last save are
// dropped; a creation leaves the screen, a saved document is read again and
// "APRES_ABANDON" runs.
//
// A failed user action is undone whole by the session (database and memory
// images alike); the document then stays in the mode it had.
#pragma once

#include <string>
#include <string_view>

#include "host/automate.h"

namespace model {

using namespace host;

class AutomTab : public Automate {
 public:
  explicit AutomTab(Evt* e);

  // Sort plan and index by which the main table's records are browsed
  // ("($TRI$", "INDX1"). Kept for the screen description; documents are opened by
  // their identifier.
  void planTri(const char* plan, const char* index);
  const std::string& planTri() const { return sort_plan_; }
  const std::string& indexTri() const { return sort_index_; }

  bool estEcran() const override { return true; }

 private:
  std::string sort_plan_, sort_index_;
};

class Saisie : public AutomTab {
 public:
  explicit Saisie(Evt* e);

  // Name of the screen description ("+GESTION1").
  void nomEcran(const char* name) { screen_name_ = name ? name : ""; }
  const std::string& nomEcran() const { return screen_name_; }

  // The mode string (see above). Throws HostError for a letter that is no mode.
  void modeSaisie(std::string_view modes);
  void modeSaisie(const Donnee& modes) { modeSaisie(modes.chaine()); }
  // Current mode: "C", "M" or "V"; "" before a document is shown.
  std::string modeCourant() const { return mode_ ? std::string(1, mode_) : std::string(); }
  // Whether the mode string allows mode `m` ('C', 'M', 'V' or 'A').
  bool modePermis(char m) const;

  // ---- standard events; each is the base of the branch of its upper-case name
  // "AVANT_SUPPRESSION": allows the deletion. A handler that refuses it returns
  // without calling the base.
  virtual void avant_suppression(Evt* e);
  // "DEBUT_VISUALISATION", "DEBUT_MODIFICATION", "DEBUT_CREATION": the mode just
  // started; the base does nothing.
  virtual void debut_visualisation(Evt* e);
  virtual void debut_modification(Evt* e);
  virtual void debut_creation(Evt* e);
  // "FIN_CREATION": a creation was saved; the base does nothing.
  virtual void fin_creation(Evt* e);
  // "VALIDATION": saves the document (see above). Throws HostError when a data step
  // refuses, so that the user action is undone whole.
  virtual void validation(Evt* e);
  // "CTRL_OUVRE": the user opens the choice of a list column; parameter 0 is the
  // control's name. The base has no choice window of its own and does nothing.
  virtual void ctrl_ouvre(Evt* e);
  // "CTRL_ACTUALISER_MODE": the mode shown must be refreshed; the base does nothing.
  virtual void ctrl_actualiser_mode(Evt* e);
  // "CREATION": starts the creation of a new document (see above). Refused when
  // the mode string does not allow it.
  virtual void creation(Evt* e);
  // "SUPPRESSION": the user asks to delete the document on screen (see above).
  virtual void suppression(Evt* e);

  void demarrer() override;

  // Identifier of the document on screen ("" in creation until it is saved).
  std::string identifiantDocument();

  // Applies a switch to visualisation asked by a handler (Ecran::toVisu) to a
  // document in modification. The cycle and the user's hands call it after each
  // step or action.
  void applyVisuRequest();

  void keepState(host::Snapshot& snapshot) override;

 protected:
  // Switches to mode `m` and, when `announce`, runs its start event.
  void enterMode(char m, bool announce = true);
  // Makes `t`'s buffer a new record that keeps its values: its next ecrit() inserts.
  static void makeNew(Table& t);
  // Reads the document `ident` (SELECTION_TRI included); false when it is not shown.
  bool openDocument(const std::string& ident);
  // Ends a line entry before the document is saved; false when the line was
  // refused. Documents without lines have none.
  virtual bool closeLineEntry() { return true; }
  // Drops a line entry (the document is abandoned, deleted or shown read-only).
  virtual void discardLineEntry() {}
  // Line storage, given by Sdocum. `extract` runs the extraction data step per line.
  virtual void loadLines(bool extract) { (void)extract; }
  virtual void clearLines() {}
  virtual void saveLines(const std::string& ident) { (void)ident; }
  virtual void deleteLines(const std::string& ident) { (void)ident; }

  // Set by the bases that allow what the cycle then does.
  bool saved_ = false;
  bool deletion_allowed_ = false;

 private:
  std::string screen_name_;
  std::string allowed_;
  char start_ = 0;
  char mode_ = 0;
};

class Setape : public Saisie {
 public:
  explicit Setape(Evt* e);

  // "MODIFICATION": the request to modify the document on screen. The base
  // switches to modification and runs "DEBUT_MODIFICATION"; refused when the mode
  // string does not allow it. A handler that refuses returns without calling it,
  // or asks for visualisation (Ecran::toVisu).
  virtual void modification(Evt* e);
  // "VALID_DOC": the validation cycle (see above). Refused when nothing was saved.
  virtual void valid_doc(Evt* e);
  // "ABAND_DOC": drops the changes (see above).
  virtual void aband_doc(Evt* e);
};

}  // namespace model
