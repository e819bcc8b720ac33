// `mirvae print`: a form or a list of a dossier's operations as a PDF file.
#pragma once

#include <string>

namespace app {

struct PrintRequest {
  std::string dossier;
  std::string print;  // "fiche1" ... "fiche6", "liste1" ... "liste6"
  std::string ident;  // a form: the operation's IDENT
  // A list: the criteria an access screen would give; one left empty is left out of
  // the request (the heading then shows "..." or "31/12/9999", or nothing).
  std::string from, to, account, direction;
  std::string output;  // the file; "" for the dossier's print folder
};

// Prints and returns the file written. Throws HostError naming what is wrong: an
// unknown print name, a form of an operation the dossier does not hold for that
// kind, a criterion the kind has not or that is not a date, a failed print.
std::string imprimer(const PrintRequest& request);

}  // namespace app
