#include "services/sysascii.h"

#include "services/common.h"

namespace services {

using namespace host;

Sysascii::Sysascii(Evt* e) : Automate(e) { addBranch("REMPLACER", &Sysascii::remplacer); }

void Sysascii::remplacer(Evt* e) {
  exigerParametres(e, 3);
  std::string text = e->parametre(0).chaine();
  std::string find = e->parametre(1).chaine(), replacement = e->parametre(2).chaine();
  if (find.empty()) return;
  for (std::size_t at = text.find(find); at != std::string::npos; at = text.find(find, at + replacement.size()))
    text.replace(at, find.size(), replacement);
  e->parametre(0) = text;
}

}  // namespace services
