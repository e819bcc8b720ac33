// The base of the entry screens: Gestion_document2 : Gestion_document : Sdocum.
// The document cycle is described in model/saisie.h, the lines in model/sdocum.h.
#pragma once

#include "model/sdocum.h"

namespace model {

class Gestion_document : public Sdocum {
 public:
  explicit Gestion_document(Evt* e);

  // "INIT": the base does nothing.
  virtual void init(Evt* e);
};

class Gestion_document2 : public Gestion_document {
 public:
  explicit Gestion_document2(Evt* e);

  // "AVANT_DEBUT": the base accepts; a handler ends with it once its checks passed.
  virtual void avant_debut(Evt* e);
  // "CTRL_CHOISIR": the user asks for the choice of a header control; parameter 0
  // is the control's name. The base has no choice window and does nothing.
  virtual void ctrl_choisir(Evt* e);
  // "CTRL_OUVRE": a list column whose screen has no opener of its own offers the
  // screen's choice ("CTRL_CHOISIR") for that column, so that a chooser written for a
  // column is reached whichever way the user opens it.
  void ctrl_ouvre(Evt* e) override;
  // "DEBUT_FICHE": a document is on screen (opened or created); the base does
  // nothing. Handlers call it first.
  virtual void debut_fiche(Evt* e);
  // "CREAT2": creates a new document from the one on screen. The header's values
  // are kept (the handler has adjusted them before calling the base) but it becomes
  // a new record without identifier; the lines are dropped (the handler imports the
  // ones it wants in "APRES_DEBUT_CREATION"). Then creation mode, "DEBUT_FICHE" and
  // "APRES_DEBUT_CREATION". Refused when creation is not allowed or nothing is shown.
  virtual void creation2(Evt* e);
};

}  // namespace model
