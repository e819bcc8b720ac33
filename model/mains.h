// The user's hands: how a scripted user, a test or the demo acts on the screen in
// front of the session, as a person would.
//
// Each call is one user action (Session::action): what it writes lands whole or
// not at all, the procedures it queues run before it ends, and the screen then
// catches up (an access list is refilled, a document asked to switch to
// visualisation does, a document's list redisplayed shows its lines again). Each is recorded in the session's transcript: "saisie"
// (object = text), "action" (the action, a list move), "refus" (the object or
// action refused, with the control that has the focus). A call returns true when
// the action was accepted, false when it was refused or failed (a failure is in the
// transcript as "erreur" and nothing it wrote is kept).
//
// Objects are named as the screen names them:
//   - a variable: "VDATE_DEBUT";
//   - a field: "MIRVAE.DTOPE" (its branch is the bare field name, "DTOPE", for the
//     main table, else "TABLE.FIELD");
//   - a list column of a document: "LST_V_HT" (a variable shown per line) or
//     "LST_MIRVAL.NUMCP" (a field of the current line).
// Every call throws HostError when there is no screen in front, or when it names
// an object the screen does not know; that is a mistake of the script, not of the
// user.
#pragma once

#include <string>
#include <vector>

#include "host/session.h"
#include "model/row_text.h"

namespace model {

// The screen in front of the user.
host::Automate& ecranDevant(host::Session& session);

// Opens module `name` (registry name) as a user would from a menu; false when its
// start failed (it is then closed) or when a screen left at once. A process runs
// to its end.
bool ouvrir(host::Session& session, const std::string& name);
// Closes the screen in front.
void fermer(host::Session& session);

// Types `text` into `object`, then runs the branch of that object if the screen
// has one ("<branch>_ENTREE" first, when it exists). An amount is taken with the
// decimals of the screen's currency (model/shown.h), as the screen then shows it,
// and recorded so. Refused (the previous value is put back, the focus stays) when
// the screen forbade or hid the object under any of its names ("MIRVAE.NUMJL" is
// "NUMJL" on the MIRVAE screen, "LST_MIRVAL.COTVA" is "MIRVAL.COTVA"), before any
// handler runs; when the document is in visualisation; when the text is not a value
// of the object's kind (an amount beyond 15 integer digits is none), with a message;
// or when the branch rejects the input.
bool saisir(host::Session& session, const std::string& object, const std::string& text);
// Presses an action: runs the branch of that name ("GERER", "B_VALID_DOC").
// Refused when the screen disabled or hid it, under any of its names.
bool appuyer(host::Session& session, const std::string& action);
// Asks for the choice window of a control: "CTRL_OUVRE" for a list column,
// "CTRL_CHOISIR" otherwise, with the control's name. Refused when the screen
// disabled or hid the control.
bool ouvrirChoix(host::Session& session, const std::string& object);

// The list of a document (model/sdocum.h for the steps each runs).
bool nouvelleLigne(host::Session& session);
bool allerLigne(host::Session& session, int n);  // from 1
bool validerLigne(host::Session& session);
bool supprimerLigne(host::Session& session);
bool abandonnerLigne(host::Session& session);

// The list of the screen in front (an access list or a document's lines).
std::vector<RowText> lignes(host::Session& session);
// How many rows that list shows, without making their text.
std::size_t nombreLignes(host::Session& session);
// Selects row n (from 1) of an access list.
bool choisirLigne(host::Session& session, int n);

// Whether the screen in front forbade (disabled) or hid `object`, under any of its
// names: what the hands refuse to act on, and what a front end greys or leaves out.
bool estInterdit(host::Session& session, const std::string& object);
bool estCache(host::Session& session, const std::string& object);

// What the screen shows for `object` (named as for saisir): dates DD/MM/YYYY.
std::string valeur(host::Session& session, const std::string& object);

}  // namespace model
