#include "services/messages.h"

#include "host/error.h"
#include "host/session.h"
#include "services/common.h"

namespace services {

using namespace host;

Cpmessag::Cpmessag(Evt* e) : Automate(e) {
  nomLibelles("LIBE1", "LIBEL");
  addBranch("MESS_OK", &Cpmessag::mess_ok);
  addBranch("MESS_ON", &Cpmessag::mess_on);
  addBranch("MESS_OK2", &Cpmessag::mess_ok2);
  addBranch("MESS_OK3", &Cpmessag::mess_ok3);
}

void Cpmessag::mess_ok(Evt* e) {
  exigerParametres(e, 1);
  session().montrer(e->parametre(0).chaine());
}

void Cpmessag::mess_on(Evt* e) { questionOuiNon(*this, e); }

void Cpmessag::mess_ok2(Evt* e) {
  exigerParametres(e, 2);
  std::string answer = session().dialoguer("Information", e->parametre(0).chaine(), {"1~OK", "2~Voir le mémo"});
  e->parametre(1) = answer;
}

void Cpmessag::mess_ok3(Evt* e) {
  exigerParametres(e, 1);
  std::string memo = e->parametre(0).chaine();
  std::string text;
  try {
    text = libelle(memo);
  } catch (const HostError&) {
    text = "Le mémo « " + memo + " » est introuvable.";
  }
  session().montrer(text);
}

MirvaeBiblioproc::MirvaeBiblioproc(Evt* e) : Automate(e) {
  nomBase("MIRVAE");
  addBranch("ERREUR_TABLE", &MirvaeBiblioproc::erreur_table);
}

void MirvaeBiblioproc::erreur_table(Evt* e) {
  exigerParametres(e, 3);
  session().montrer("Erreur d'accès à une table (écran " + e->parametre(0).chaine() + ", étape " +
                    e->parametre(1).chaine() + ", code " + e->parametre(2).chaine() + ").");
}

bool questionOuiNon(Automate& self, Evt* e) {
  exigerParametres(e, 1);
  bool yes = self.session().demander(e->parametre(0).chaine());
  self.erreurMethode(yes ? 1 : 0, e);
  return yes;
}

}  // namespace services
