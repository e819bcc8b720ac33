#include "services/analytics.h"

#include "host/session.h"
#include "services/common.h"

namespace services {

using namespace host;

AnalyticCodes::AnalyticCodes(Evt* e, const char* interfaceTable, const char* source, const char* key,
                             const char* window)
    : Automate(e), interface_(interfaceTable), source_(source), key_(key), window_(window) {
  nomBase("CP");
  addBranch("LECTURE", &AnalyticCodes::lecture);
  addBranch("CHOIX", &AnalyticCodes::choix);
}

bool AnalyticCodes::read(const std::string& code) {
  return remplirInterface(interface_, source_, key_, Valeur::texte(code));
}

void AnalyticCodes::lecture(Evt* e) {
  exigerParametres(e, 1);
  erreurMethode(read(e->parametre(0).chaine()) ? 0 : 1, e);
}

void AnalyticCodes::choix(Evt* e) {
  exigerParametres(e, 1);
  std::optional<std::string> pick = fenetreDeChoix(
      session(), window_,
      colonne(session().base(), std::string("SELECT ") + key_ + " FROM " + source_ + " ORDER BY " + key_));
  if (!pick) {
    read(e->parametre(0).chaine());
    erreurMethode(1, e);
    return;
  }
  read(*pick);
  e->parametre(0) = *pick;
}

}  // namespace services
