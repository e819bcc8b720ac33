#include "services/cpcdtva.h"

#include "host/session.h"
#include "services/common.h"

namespace services {

using namespace host;

Cpcdtva::Cpcdtva(Evt* e) : Automate(e) {
  nomBase("CP");
  addBranch("CHOIX", &Cpcdtva::choix);
}

void Cpcdtva::choix(Evt* e) {
  exigerParametres(e, 3);
  std::string type = e->parametre(2).chaine();
  std::vector<std::string> codes =
      type.empty() ? colonne(session().base(), "SELECT COTVA FROM CDTVA ORDER BY COTVA")
                   : colonne(session().base(), "SELECT COTVA FROM CDTVA WHERE TYTVA = ? ORDER BY COTVA", {type});
  std::optional<std::string> pick =
      fenetreDeChoix(session(), type.empty() ? "Codes TVA" : "Codes TVA de type " + type, codes);
  if (pick) e->parametre(0) = *pick;
  int error = pick ? 0 : 2;
  e->parametre(1) = error;
  erreurMethode(error, e);
}

}  // namespace services
