#include "services/cpcompt.h"

#include "host/database.h"
#include "host/error.h"
#include "host/session.h"
#include "services/common.h"

namespace services {

using namespace host;

Cpcompt::Cpcompt(Evt* e) : Automate(e) {
  nomBase("CP");
  addBranch("CHOIX_INTITULE_REDUIT", &Cpcompt::choix_intitule_reduit);
  addBranch("LECTURE", &Cpcompt::lecture);
}

void Cpcompt::choix_intitule_reduit(Evt* e) {
  exigerParametres(e, 4);
  std::string start = e->parametre(1).chaine();
  std::string natures = e->parametre(2).chaine();
  std::string column = e->parametre(3).chaine();
  if (column != "NUMCP" && column != "LIBCP")
    throw HostError("colonne « " + column + " » inconnue de la fenêtre de choix des comptes");
  // A pattern ending with "*" narrows the window: the one the caller gives, to the
  // accounts whose number begins with it; else the beginning the user typed in the
  // value itself, to the values of the column that begin with it.
  auto pattern = [](const std::string& text) {
    return !text.empty() && text.back() == '*' ? text.substr(0, text.size() - 1) : std::string();
  };
  std::string numbers = pattern(start);
  std::string typed = numbers.empty() ? pattern(e->parametre(0).chaine()) : std::string();
  std::string prefix = numbers.empty() ? typed : numbers;

  Statement& s = session().base().prepare("SELECT NUMCP, LIBCP, NATUC FROM COMPT WHERE CCTRA <> 'O' ORDER BY " +
                                          column + ", NUMCP");
  std::vector<std::string> rows;
  while (s.step()) {
    std::string number = s.text(0), value = column == "NUMCP" ? number : s.text(1), nature = s.text(2);
    bool natureFits = natures.empty() || nature.find_first_of(natures) != std::string::npos;
    if (natureFits && number.starts_with(numbers) && value.starts_with(typed)) rows.push_back(value);
  }
  s.reset();

  std::string window = "Comptes";
  if (!natures.empty()) window += " de nature " + natures;
  if (!prefix.empty()) window += " commençant par " + prefix;
  std::optional<std::string> pick = fenetreDeChoix(session(), window, rows);
  if (!pick) {
    erreurMethode(1, e);
    return;
  }
  e->parametre(0) = *pick;
}

void Cpcompt::lecture(Evt* e) {
  exigerParametres(e, 1);
  bool found = remplirInterface("I_CPCOMPT", "COMPT", "NUMCP", Valeur::texte(e->parametre(0).chaine()));
  erreurMethode(found ? 0 : 1, e);
}

}  // namespace services
