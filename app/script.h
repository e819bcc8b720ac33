// Session scripts: a scripted user acting on the screens, one action a line
// (app/script_format.h for the text, app/script_player.h for how it is played).
#pragma once

#include <istream>
#include <ostream>
#include <string>

namespace app {

// Loads the library and, beside it, the stand-ins of the modules it calls by name;
// once per process.
void chargerModules();

// Who acts in a session: the person running the program.
std::string userName();

// Where a session on `dossier` prints: the folder "NAME-impressions" beside the
// dossier file "NAME.db", one PDF file a print.
std::string dossierImpressions(const std::string& dossier);

// Plays the script in `script` on the dossier, printing the transcript to `out` as
// it grows. Returns 0 when every line was understood and every expectation held,
// 1 otherwise, the failing line named on `out` ("script.txt:12: ..."). Throws
// HostError when the dossier or the script file cannot be opened.
int jouerFichier(const std::string& dossier, const std::string& script, std::ostream& out);
int jouer(const std::string& dossier, std::istream& script, const std::string& scriptName, std::ostream& out);

// Makes a fresh demo dossier at `path` (replacing an existing dossier there; any
// other file is refused with a HostError), plays the built-in demo script on it,
// prints what the user saw, the resulting ledger and where the dossier is. Returns
// as jouer does.
int demo(const std::string& path, std::ostream& out);

}  // namespace app
