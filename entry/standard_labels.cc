#include "entry/parts.h"

namespace entry {

StandardLabels::StandardLabels(EntryScreen& screen) : Part(screen) {}

void StandardLabels::provide(Handlers& handlers) {
  handlers.add("TYPLB_CHOISIR", this, &StandardLabels::typlb_choisir);
  handlers.add("TESTS_VALIDATION", this, &StandardLabels::tests_validation);
}

bool StandardLabels::chooses(const std::string& control) {
  if (control != "MIRVAE.INPIE") return false;
  s_.procedure("TYPLB_CHOISIR");
  return true;
}

bool StandardLabels::documentAccepted(Evt*) {
  s_.procedure("TESTS_VALIDATION");
  return s_.erreurMethode() == 0;
}

void StandardLabels::typlb_choisir(Evt*) {
  if (!s_.chooseStandardText("CHOIX_TABLE_TYPLB", TYPLB, TYPLB_CTYLB, TYPLB_ITYLB, s_.MIRVAE_INPIE)) return;
  s_.ecran()->affiche("INPIE", "");
}

// Stops at the first line whose account cannot take the entry, with the method
// result at 1.
void StandardLabels::tests_validation(Evt* e) {
  auto refuse = [&](const std::function<void()>& tell) {
    tell();
    // Telling the user went through another library, whose result replaced ours.
    s_.erreurMethode(1, e);
  };
  s_.erreurMethode(0, e);
  Table& lines = s_.MEM_MIRVAL;
  lines.initRequete();
  lines.activeRequete();
  for (int rc = lines.suivant(3); rc == 0; rc = lines.suivant(1)) {
    std::string account = lines.valeur("NUMCP").chaine();
    if (account.ends_with('*'))
      return refuse([&] { s_.messageOk("Le compte suivant doit être renseigné : " + account); });
    if (s_.COMPT.lit(3, s_.COMPT_NUMCP, '=', account) != 0)
      return refuse([&] { s_.messageOk(s_.libelle("0012") + account); });
    if (s_.COMPT_CCTRA == "O")
      return refuse([&] {
        EvtParamRef message(2, s_.libelle("00361") + account, &s_.V_CHOIX);
        s_.appelerProcedure("*", "CPMESSAG", "INTERFACE", "MESS_OK2", &message, -1);
        if (s_.V_CHOIX == "2") {
          EvtParamVal memo(1, "MEMO1.TXT");
          s_.appelerProcedure("*", "CPMESSAG", "INTERFACE", "MESS_OK3", &memo, -1);
        }
      });
  }
}

}  // namespace entry
