#include "services/zefndoc.h"

#include "host/counter.h"
#include "host/database.h"
#include "host/error.h"
#include "host/session.h"
#include "services/common.h"

namespace services {

using namespace host;

namespace {

constexpr int kMaxWidth = 18;  // every identifier of that width fits a 64-bit counter

struct Request {
  std::string name;
  int width;
};

// Checks the parameters shared by both procedures.
Request readRequest(Evt* e) {
  exigerParametres(e, 6);
  std::string base = e->parametre(0).chaine(), table = e->parametre(1).chaine();
  if (base != "CP") throw HostError("base « " + base + " » inconnue du service des numéros");
  if (table != "NDOC") throw HostError("table de compteurs « " + table + " » inconnue du service des numéros");
  Request r{e->parametre(2).chaine(), static_cast<int>(e->parametre(4).entier())};
  if (r.name.empty()) throw HostError("compteur de numéros non renseigné");
  if (r.width < 1 || r.width > kMaxWidth)
    throw HostError("largeur " + std::to_string(r.width) + " invalide pour les numéros de « " + r.name + " »");
  return r;
}

}  // namespace

Zefndoc::Zefndoc(Evt* e) : Automate(e) {
  nomBase("CP");
  addBranch("ATTRIBUE_NUMERO", &Zefndoc::attribue_numero);
  addBranch("VALIDE_NUMERO", &Zefndoc::valide_numero);
}

void Zefndoc::attribue_numero(Evt* e) {
  Request r = readRequest(e);
  Database& db = session().base();
  std::string ident;
  dansUnite(db, [&] { ident = host::nextIdentifier(db, r.name, r.width); });
  e->parametre(5) = ident;
}

void Zefndoc::valide_numero(Evt* e) {
  Request r = readRequest(e);
  std::string ident = e->parametre(5).chaine();
  std::vector<std::string> last = colonne(session().base(), "SELECT DERNIER FROM NDOC WHERE NOM = ?", {r.name});
  bool drawn = static_cast<int>(ident.size()) == r.width && ident.find_first_not_of("0123456789") == std::string::npos &&
               !last.empty() && std::stoll(ident) >= 1 && std::stoll(ident) <= std::stoll(last.front());
  if (!drawn) throw HostError("le numéro « " + ident + " » de « " + r.name + " » n'a pas été attribué");
}

}  // namespace services
