#include "services/monnaie.h"

#include "host/error.h"
#include "host/session.h"
#include "services/common.h"

namespace services {

using namespace host;

namespace {

void readCurrency(const std::string& code) {
  if (code.empty()) throw HostError("monnaie non renseignée");
  if (!remplirInterface("I_MONNAIE", "MONNAIE", "IDENT", Valeur::texte(code)))
    throw HostError("monnaie « " + code + " » inconnue du dossier");
}

}  // namespace

Monnaie::Monnaie(Evt* e) : Automate(e) {
  nomBase("CP");
  addBranch("LECTURE", &Monnaie::lecture);
  addBranch("CHOIX", &Monnaie::choix);
}

void Monnaie::lecture(Evt* e) {
  exigerParametres(e, 1);
  readCurrency(e->parametre(0).chaine());
}

void Monnaie::choix(Evt* e) {
  exigerParametres(e, 1);
  std::optional<std::string> pick =
      fenetreDeChoix(session(), "Monnaies", colonne(session().base(), "SELECT IDENT FROM MONNAIE ORDER BY IDENT"));
  if (!pick) {
    erreurMethode(2, e);
    return;
  }
  readCurrency(*pick);
  e->parametre(0) = *pick;
}

}  // namespace services
