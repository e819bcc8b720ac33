#include "model/mains.h"

#include "host/automate.h"
#include "host/error.h"

namespace model {

host::Automate& ecranDevant(host::Session& session) {
  host::Automate* front = session.ecranCourant();
  if (!front) throw host::HostError("aucun écran n'est ouvert");
  return *front;
}
bool ouvrir(host::Session&, const std::string&) { return false; }
void fermer(host::Session&) {}
bool saisir(host::Session&, const std::string&, const std::string&) { return false; }
bool appuyer(host::Session&, const std::string&) { return false; }
bool ouvrirChoix(host::Session&, const std::string&) { return false; }
bool nouvelleLigne(host::Session&) { return false; }
bool allerLigne(host::Session&, int) { return false; }
bool validerLigne(host::Session&) { return false; }
bool supprimerLigne(host::Session&) { return false; }
bool abandonnerLigne(host::Session&) { return false; }
std::vector<RowText> lignes(host::Session&) { return {}; }
bool choisirLigne(host::Session&, int) { return false; }
std::string valeur(host::Session&, const std::string&) { return ""; }

}  // namespace model
