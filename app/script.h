// Session scripts: a scripted user acting on the screens, one action a line.
#pragma once

#include <istream>
#include <ostream>
#include <string>

namespace app {

// Plays the script in `script` on the dossier, prints the transcript to `out`.
// Returns 0 when every line was understood and every expectation held, 1 otherwise
// (the failing line is named on `out`).
int jouerFichier(const std::string& dossier, const std::string& script, std::ostream& out);
int jouer(const std::string& dossier, std::istream& script, const std::string& scriptName, std::ostream& out);

// Makes a fresh demo dossier at `path` (replacing it), plays the client-invoice road
// on it, prints what the user saw and the resulting ledger.
int demo(const std::string& path, std::ostream& out);

}  // namespace app
