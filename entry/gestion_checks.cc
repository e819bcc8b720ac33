// The checks of the header and of the document as a whole, and the account check
// shared by the header and the lines. A failed check shows its message, puts the
// focus on the faulty control, refuses its event and leaves the method result at 1.
#include "entry/gestion.h"

namespace entry {

void EntryScreen::dtope(Evt* e) {
  if (!MIRVAE_DTOPE.estVide() && MIRVAE_DTOPE < PARAM_PDDEX) return refuser(e, libelle("0134"), "");
  if (!MIRVAE_DTOPE.estVide() && MIRVAE_DTOPE > PARAM_PDTCL) return refuser(e, libelle("0135"), "");
  // The due date follows the operation date.
  MIRVAE_DTECH = MIRVAE_DTOPE;
  ecran()->affiche("DTECH", "");
}

void EntryScreen::controler_compt(Evt* e) {
  Chaine P_1("P_1", "", "", 4, this), P_2("P_2", "", "", 4, this), P_3("P_3", "", "", 4, this);
  e->param(0, P_1, 0);
  e->param(1, P_2, 0);
  e->param(2, P_3, 0);
  erreurMethode(0, e);
  if (P_2.estVide()) return;

  Chaine V_CNATC("V_CNATC", "", "", 4, this), V_INATC("V_INATC", "", "", 4, this);
  V_CNATC = P_3;
  V_INATC = natureLabel(V_CNATC.chaine());
  if (!readAccountForCheck(P_1.chaine(), P_2)) return refuserCompte(e, "Le compte est inexistant !");
  if (COMPT_NATUC.position(V_CNATC.chaine()) == 0) {
    COMPT.raz();
    refuserCompte(e, "Le compte n'est pas de nature <" + V_INATC.chaine() + "> !");
  }
}

std::string EntryScreen::natureLabel(const std::string& letter) {
  Chaine V_CNATC("V_CNATC", "", "", 4, this), V_INATC("V_INATC", "", "", 4, this);
  V_CNATC = letter;
  EvtParamRef nature(2, &V_CNATC, &V_INATC);
  compta("LIBELLE_NATURE_COMPTE", &nature);
  return V_INATC.chaine();
}

bool EntryScreen::readAccountForCheck(const std::string& column, const Donnee& value) {
  Champ colonne(column.c_str(), &COMPT);
  if (COMPT.lit(3, colonne, '=', value) != 0) return false;
  // The account again, among those the lists offer: an account left out of them
  // (CCTRA "O") reads blank and fails every nature test.
  COMPT.initRequete();
  COMPT.ajouteFiltre(COMPT_CCTRA, '#', "O");
  COMPT.ajouteFiltre(colonne, '=', value);
  COMPT.choisitIndex(column.c_str());
  COMPT.activeRequete();
  if (COMPT.suivant(3) != 0) COMPT.raz();
  return true;
}

void EntryScreen::refuserCompte(Evt* e, const std::string& message) {
  messageOk(message);
  erreurMethode(1, e);
}

void EntryScreen::p1_sortie(Evt*) {}

void EntryScreen::grp1_sortie(Evt*) {
  procedure("CONTROLER_P1");
  if (erreurMethode() != 0) return;
  procedure("CONTROLER_GRP1");
}

void EntryScreen::controler_p1(Evt* e) {
  erreurMethode(1, e);
  if (MIRVAE_DTOPE.estVide()) return refuser(e, "La saisie d'une date d'opération est obligatoire !", "DTOPE");
  // The journal may have been typed: only one of the kind's nature takes the operation.
  if (!lireJournal() || JONAL_TYPJL != kind_.journalNature)
    return refuser(e, "Le journal <" + MIRVAE_NUMJL.chaine() + "> n'existe pas ou n'est pas de la nature attendue !",
                   "NUMJL");
  // Year-months compare as text: "YYYYMM".
  if (anneeMois() <= JONAL_CLOAM.chaine())
    return refuser(e, "Le journal <" + JONAL_NUMJL.chaine() + "> est clos pour cette date !", "DTOPE");
  if (MIRVAE_NPIEC.estVide()) return refuser(e, "La saisie d'un numéro de pièce est obligatoire !", "NPIEC");
  erreurMethode(0, e);
}

void EntryScreen::controler_grp1(Evt* e) {
  erreurMethode(1, e);
  for (Part* part : parts_)
    if (!part->headerAccepted(e)) return;
  if (MIRVAE_INPIE.estVide()) return refuser(e, "La saisie d'un libellé de pièce est obligatoire !", "INPIE");
  erreurMethode(0, e);
}

void EntryScreen::controler_lst(Evt* e) {
  erreurMethode(1, e);
  MEM_MIRVAL.initRequete();
  if (MEM_MIRVAL.nombre() == 0) return refuser(e, "Aucune ligne n'a été saisie.@La validation est impossible !", "");
  for (Part* part : parts_)
    if (!part->linesAccepted(e)) return;
  erreurMethode(0, e);
}

}  // namespace entry
