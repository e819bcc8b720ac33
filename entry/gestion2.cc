#include "entry/gestion2.h"

#include <string>
#include <vector>

MIRVAEGestion2::MIRVAEGestion2(host::Evt* e) : EntryScreen(e, registry::operationKind(2)) {
  registerBranches(entry::kInvoiceBranches);
}

void MIRVAEGestion2::controler_compt(host::Evt* e) {
  host::Chaine P_1("P_1", "", "", 4, this), P_2("P_2", "", "", 4, this), P_3("P_3", "", "", 4, this);
  e->param(0, P_1, 0);
  e->param(1, P_2, 0);
  e->param(2, P_3, 0);
  erreurMethode(0, e);
  if (P_3.estVide() || P_2.estVide()) return;
  std::string letters = P_3 == "H" ? "HM" : P_3.chaine();
  // The first three letters, each with its label.
  std::vector<std::string> labels;
  letters.resize(std::min<std::size_t>(letters.size(), 3));
  for (char letter : letters) labels.push_back(natureLabel(std::string(1, letter)));

  if (!readAccountForCheck(P_1.chaine(), P_2)) return refuserCompte(e, "Le compte est inexistant !");
  if (COMPT_NATUC.chaine().find_first_of(letters) != std::string::npos) return;
  COMPT.raz();
  std::string message = "Le compte n'est pas de nature <" + labels.front() + ">";
  for (std::size_t i = 1; i < labels.size(); ++i) message += "@ni <" + labels[i] + ">";
  refuserCompte(e, message);
}
