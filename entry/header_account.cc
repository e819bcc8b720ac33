#include "entry/parts.h"

namespace entry {

HeaderAccount::HeaderAccount(EntryScreen& screen) : Part(screen) {}

void HeaderAccount::provide(Handlers& handlers) {
  handlers.add("VLIBCP1", this, &HeaderAccount::vlibcp1);
  handlers.add("COMPT1_CHOISIR", this, &HeaderAccount::compt1_choisir);
}

void HeaderAccount::started() {
  COMPT1.initRequete();
  COMPT1.ajouteFiltre(COMPT1_NATUC, '?', nature());
  COMPT1.ajouteFiltre(COMPT1_CCTRA, '#', "O");
  COMPT1.choisitIndex("LIBCP");
  COMPT1.activeRequete();
}

void HeaderAccount::opened() {
  if (!EntryScreen::lireOuVider(COMPT1, COMPT1_NUMCP, s_.MIRVAE_NUMCP))
    VLIBCP1 = s_.enCreation() ? std::string()
                              : s_.kind().headerUnknownOpen + s_.MIRVAE_NUMCP.chaine() + "> inexistant !";
  else
    VLIBCP1 = COMPT1_LIBCP;
}

bool HeaderAccount::headerAccepted(Evt* e) {
  if (!s_.MIRVAE_NUMCP.estVide()) return true;
  s_.refuser(e, s_.kind().headerRequired, "VLIBCP1");
  return false;
}

bool HeaderAccount::chooses(const std::string& control) {
  if (control != "VLIBCP1") return false;
  s_.procedure("COMPT1_CHOISIR");
  return true;
}

// A read by key ignores a binding's request: whether the account is one the header
// may take is asked of the dossier with the list's filters.
bool HeaderAccount::takesModelAccount(const std::string& account) {
  if (!EntryScreen::readAccountOfNature(COMPT1, COMPT1_NUMCP, COMPT1_NATUC, COMPT1_CCTRA, account, nature().c_str()))
    return false;
  s_.MIRVAE_NUMCP = COMPT1_NUMCP;
  VLIBCP1 = COMPT1_LIBCP;
  return true;
}

void HeaderAccount::vlibcp1(Evt* e) {
  if (VLIBCP1.estVide()) {
    s_.MIRVAE_NUMCP = "";
    s_.ecran()->affiche("VLIBCP1", "");
    return;
  }
  if (COMPT1.lit(3, COMPT1_LIBCP, '=', VLIBCP1) != 0) return s_.refuser(e, s_.kind().headerMissing, "VLIBCP1");
  EvtParamVal controle(3, "LIBCP", &VLIBCP1, nature());
  s_.procedure("CONTROLER_COMPT", &controle);
  if (s_.erreurMethode() != 0) {
    s_.controler("VLIBCP1");
    s_.rejeter(e);
    return;
  }
  s_.MIRVAE_NUMCP = s_.COMPT_NUMCP;
}

void HeaderAccount::compt1_choisir(Evt*) {
  if (s_.enVisualisation()) {
    s_.messageOk("Opération interdite en mode visualisation !");
    return;
  }
  EvtParamRef choix(5, &VLIBCP1, &COMPT1_LIBCP, nature(), "LIBCP", "N");
  s_.appelerProcedure("*", "CPCOMPT", "INTERFACE", "CHOIX_INTITULE_REDUIT", &choix, -1);
  s_.enFile("VLIBCP1");
}

}  // namespace entry
