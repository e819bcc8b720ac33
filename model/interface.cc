#include "model/interface.h"

#include "host/database.h"
#include "host/error.h"
#include "host/registry.h"
#include "host/session.h"
#include "model/impetat.h"

namespace model {

std::string requeteFiche(const std::string& ident) { return "Select * From TABLE Where IDENT = " + quoteText(ident); }

Interface2::Interface2(Evt* e) : Interface(e) {
  addBaseBranch("IMPRESSION", [this](Evt* ev) { impression(ev); });
}

std::string Interface2::printJobFor(const std::string& printName) const {
  bool known = printName.size() == 6 && printName[5] >= '1' && printName[5] <= '6' &&
               (printName.compare(0, 5, "fiche") == 0 || printName.compare(0, 5, "liste") == 0);
  if (!known) throw HostError("nom d'impression « " + printName + " » inconnu");
  std::string kind = printName.compare(0, 5, "fiche") == 0 ? "IMPR_FICHE" : "IMPR_LISTE";
  return nomSource() + "-" + kind + printName.substr(5);
}

void Interface2::impression(Evt* e) {
  if (e->nbParams() < 2) throw HostError("« IMPRESSION » attend le nom de l'impression et sa requête");
  std::string job = printJobFor(e->parametre(0).chaine());
  if (!Registre::instance().module(job))
    throw HostError("le module d'impression « " + job + " » n'est pas enregistré");
  AutomatePtr printer = Registre::instance().creer(job, nullptr);
  auto* print = dynamic_cast<Impetat*>(printer.get());
  if (!print) throw HostError("le module « " + job + " » n'est pas un travail d'impression");
  print->applyRequest(e->parametre(1).chaine());
  session().executer(std::move(printer));
}

}  // namespace model
