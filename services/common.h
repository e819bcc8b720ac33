// Helpers shared by the stand-ins of the accounting application's modules.
#pragma once

#include <functional>
#include <optional>
#include <string>
#include <vector>

#include "host/value.h"

namespace host {
class Automate;
class Database;
class Evt;
class Session;
}  // namespace host

namespace services {

// Asks the user to pick one of `rows` (the values of the window's key column) in the
// choice window `window`; nothing when the user cancelled. A pick that is not one of
// the rows is a HostError: the window never writes back a value it did not offer.
std::optional<std::string> fenetreDeChoix(host::Session& session, const std::string& window,
                                          const std::vector<std::string>& rows);

// The first column of every row of `sql`, with `values` bound in order.
std::vector<std::string> colonne(host::Database& db, const std::string& sql,
                                 const std::vector<std::string>& values = {});

// Runs `work` inside the unit of work under way or, when none is, inside one of its
// own that commits when `work` returns and rolls back when it throws.
void dansUnite(host::Database& db, const std::function<void()>& work);

// Begins a unit of its own without waiting for the dossier's write lock. False, with
// nothing begun, when another process holds it. Only for a caller outside any unit.
bool essayerUnite(host::Database& db);

// Replaces the content of an interface table (I_CPCOMPT, I_MONNAIE...) with the row of
// `source` whose column `key` equals `value`, or with a blank row when there is none,
// so that the caller never reads back a record left over from an earlier reading.
// Returns whether the row was found.
bool remplirInterface(const char* interfaceTable, const char* source, const char* key, const host::Valeur& value);

// The number of parameters a procedure needs; fewer is a HostError naming the
// procedure, since a missing result parameter would be lost without a word.
void exigerParametres(host::Evt* e, int count);

}  // namespace services
