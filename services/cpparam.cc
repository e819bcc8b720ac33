#include "services/cpparam.h"

#include "host/session.h"
#include "services/common.h"

namespace services {

using namespace host;

Cpparam::Cpparam(Evt* e) : Automate(e) {
  nomBase("CP");
  nomLibelles("LIBE1", "LIBEL");
  addBranch("LECTURE", &Cpparam::lecture);
  addBranch("INFO_FICHE", &Cpparam::info_fiche);
}

void Cpparam::lecture(Evt* e) {
  if (!colonne(session().base(), "SELECT PNUME FROM PARAM WHERE PNUME = 1").empty()) return;
  session().montrer(libelle("0028"));
  erreurMethode(1, e);
}

void Cpparam::info_fiche(Evt* e) {
  exigerParametres(e, 1);
  std::string text = e->parametre(0).chaine();
  for (std::size_t at = text.find("\r\n"); at != std::string::npos; at = text.find("\r\n", at + 1))
    text.replace(at, 2, "\n");
  session().montrer(text);
}

}  // namespace services
