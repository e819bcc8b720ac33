#include "app/script.h"

#include <fstream>

namespace app {

int jouerFichier(const std::string& dossier, const std::string& script, std::ostream& out) {
  std::ifstream in(script);
  return jouer(dossier, in, script, out);
}

int jouer(const std::string&, std::istream&, const std::string&, std::ostream& out) {
  out << "les scripts de session ne sont pas encore pris en charge\n";
  return 1;
}

int demo(const std::string&, std::ostream& out) {
  out << "démonstration pas encore disponible\n";
  return 1;
}

}  // namespace app
