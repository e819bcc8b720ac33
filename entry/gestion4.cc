#include "entry/gestion4.h"


namespace entry {

namespace {

// The module that matches a settlement line against the open due dates.
constexpr const char* kJustificationScreen = "GEST_JUS";

}  // namespace

TreasuryEntry::TreasuryEntry(Evt* e, int kind) : EntryScreen(e, registry::operationKind(kind)) {
  registerBranches(branchesWithout(kInvoiceBranches, {},
                                   {"TYPE_DR", "CALCUL_SOLDE", "AFFICHER_SOLDE", "TYPLB_CHOISIR", "TESTS_VALIDATION",
                                    "BT_JUSTIF", "APPEL_JUSTIFICATION", "EXTRACTION_TABLE_MIRVAJUS",
                                    "SUPPRESSION_TABLE_MIRVAJUS", "VALIDATION_TABLE_MIRVAJUS"}));
}

void TreasuryEntry::provide(Handlers& handlers) {
  EntryScreen::provide(handlers);
  handlers.add("BT_JUSTIF", this, &TreasuryEntry::bt_justif);
  handlers.add("APPEL_JUSTIFICATION", this, &TreasuryEntry::appel_justification);
}

void TreasuryEntry::ctrl_debut_ligne(Evt* e) {
  EntryScreen::ctrl_debut_ligne(e);
  account_.V_NUMCP_AVANT_MODIF = MIRVAL_NUMCP;
  ecran()->autorise("BT_JUSTIF", "");
}

void TreasuryEntry::debut_creation_ligne(Evt* e) {
  EntryScreen::debut_creation_ligne(e);
  account_.V_NUMCP_AVANT_MODIF = "";
  ecran()->interdit("BT_JUSTIF", "");
}

void TreasuryEntry::validation_ligne(Evt* e) {
  if (MIRVAL_NUMCP.estVide()) return refuser(e, account_.lineAccountRequired(), line().labelControl());
  EntryScreen::validation_ligne(e);
}

void TreasuryEntry::apres_validation_ligne(Evt* e) {
  EntryScreen::apres_validation_ligne(e);
  EvtParamVal appelant(1, "VALIDATION_LIGNE");
  procedure("APPEL_JUSTIFICATION", &appelant);
}

void TreasuryEntry::bt_justif(Evt*) {
  EvtParamVal appelant(1, "BT_JUSTIF");
  procedure("APPEL_JUSTIFICATION", &appelant);
}

// The settlement of the line's due dates, by the justification screen, when the
// dossier justifies them and the line is a third party's.
void TreasuryEntry::appel_justification(Evt* e) {
  Chaine V_APPEL("V_APPEL", "Methode appelé par BT_JUSTIF ou VALIDATION_LIGNE", "", 4, this);
  if (e && e->nbParams() > 0) e->param(0, V_APPEL, 0);
  if (account_.PARAM_PFO13 != "O") return;
  lireOuVider(COMPT, COMPT_NUMCP, MIRVAL_NUMCP);
  const std::string nature = COMPT_NATUC.chaine();
  if (nature.find_first_of("CFARS") == std::string::npos || MIRVAL_HT == 0) return justification_.discardWorkingRows();
  // A new line (its account before the change is empty) or another account: what was
  // justified is no longer.
  if (MIRVAL_NUMCP != account_.V_NUMCP_AVANT_MODIF) justification_.discardWorkingRows();

  Chaine V_TYPCPT("V_TYPCPT", "Type de compte", "", 4, this);
  if (nature.find_first_of("CFA") != std::string::npos)
    V_TYPCPT = "T";
  else if (nature.find('R') != std::string::npos)
    V_TYPCPT = "R";
  else
    V_TYPCPT = "S";
  // A payment's line debits the third party, a receipt's credits it; a negative line
  // the other way.
  Monnaie V_MTDEB("V_MTDEB", "", "", 4, this), V_MTCRE("V_MTCRE", "", "", 4, this);
  const bool positive = MIRVAL_TTC.decimal() > Decimal();
  const Decimal amount = positive ? MIRVAL_TTC.decimal() : -MIRVAL_TTC.decimal();
  if (account_.payment() == positive)
    V_MTDEB = amount;
  else
    V_MTCRE = amount;

  if (enVisualisation()) procedure("EXTRACTION_TABLE_MIRVAJUS");
  lireJournal();
  EvtParamRef justification(10, &MIRVAL_IDENT, &JONAL_TYPJL, &V_TYPCPT, &MIRVAL_NUMCP, &V_MTDEB, &V_MTCRE,
                            &PARAM_PDDEX, &MIRVAE_DTOPE, &MIRVAE_MONNAIE_IDENT, &MIRVAE_COURS);
  appelerModule("", "MIRVAE", kJustificationScreen, &justification);
}

}  // namespace entry
