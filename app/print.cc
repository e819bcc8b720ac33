#include "app/print.h"

#include "app/script.h"
#include "host/error.h"
#include "host/registry.h"
#include "host/session.h"
#include "host/table.h"
#include "model/impression.h"
#include "model/interface.h"
#include "registry/dossier.h"
#include "registry/operation_kinds.h"

namespace app {

namespace {

bool isForm(const std::string& print) { return print.rfind("fiche", 0) == 0; }

// The kind of a print name; HostError for a name that is no print.
const registry::OperationKind& kindOf(const std::string& print) {
  bool known = print.size() == 6 && (print.rfind("fiche", 0) == 0 || print.rfind("liste", 0) == 0) &&
               print[5] >= '1' && print[5] <= '6';
  if (!known) throw host::HostError("impression « " + print + " » inconnue : fiche1 à fiche6 ou liste1 à liste6");
  return registry::operationKind(print[5] - '0');
}

// The request of a list, written as the kind's access screen writes its own.
std::string listRequest(const PrintRequest& r, const registry::OperationKind& kind) {
  using host::Champ;
  using host::Valeur;
  const bool treasury = kind.number == 4 || kind.number == 5;
  if (!r.account.empty() && kind.number == 6) throw host::HostError("la liste des opérations diverses n'a pas de compte");
  if (!r.direction.empty() && !treasury)
    throw host::HostError("seules les listes de banque et de caisse ont un sens (--direction)");
  if (!r.direction.empty() && r.direction != "D" && r.direction != "R")
    throw host::HostError("sens « " + r.direction + " » inconnu : D (dépense) ou R (recette)");
  host::Table main(nullptr, "", "MIRVAE", "");
  Champ TYPE("TYPE", &main), DTOPE("DTOPE", &main), NUMCP("NUMCP", &main), TYPE_DR("TYPE_DR", &main);
  main.initRequete();
  main.ajouteFiltre(TYPE, '=', kind.type);
  if (!r.from.empty()) main.ajouteFiltre(DTOPE, '+', Valeur::depuisTexte(host::Genre::Date, r.from, "--from"));
  if (!r.to.empty()) main.ajouteFiltre(DTOPE, '-', Valeur::depuisTexte(host::Genre::Date, r.to, "--to"));
  if (!r.account.empty()) main.ajouteFiltre(NUMCP, '=', r.account);
  if (!r.direction.empty()) main.ajouteFiltre(TYPE_DR, '=', r.direction);
  main.choisitIndex("INDX1");
  return main.requete();
}

}  // namespace

std::string imprimer(const PrintRequest& r) {
  chargerModules();
  const registry::OperationKind& kind = kindOf(r.print);
  // Nobody answers: a print that asked a question would fail naming it.
  host::ReponsesPreparees nobody;
  host::Session session(registry::ouvrirDossier(r.dossier), nobody, userName());
  std::string request;
  if (isForm(r.print)) {
    if (r.ident.empty()) throw host::HostError("une fiche imprime une opération : donner son IDENT");
    host::Statement& s = session.base().prepare("SELECT count(*) FROM MIRVAE WHERE IDENT = ? AND TYPE = ?");
    s.bind(1, r.ident).bind(2, std::string(kind.type));
    bool held = s.step() && s.integer(0) > 0;
    s.reset();
    if (!held) throw host::HostError("aucune opération « " + r.ident + " » de ce type (" + kind.type + ") dans le dossier");
    request = model::requeteFiche(r.ident);
  } else {
    request = listRequest(r, kind);
  }
  model::DestinationGuard guard;
  if (r.output.empty())
    model::Imprimante::courante().versDossier(dossierImpressions(r.dossier));
  else
    model::Imprimante::courante().versFichier(r.output);
  bool printed = session.action([&] {
    host::AutomatePtr caller = host::Registre::instance().creer("MIRVAE-INTERFACE", nullptr);
    host::Chaine name(r.print), sql(request);
    host::EvtParamRef evt(2, &name, &sql);
    caller->appelerProcedure("*", "MIRVAE", "INTERFACE", "IMPRESSION", &evt, -1);
  });
  std::vector<std::string> errors = session.transcript().textes("erreur");
  if (!printed) throw host::HostError(errors.empty() ? "impression en échec" : errors.back());
  return model::Imprimante::courante().dernierFichier();
}

}  // namespace app
