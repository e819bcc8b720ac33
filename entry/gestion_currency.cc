// Currency of the operation, entry models and the import of a duplicated operation's
// lines.
//
// To be completed with the host's currency switch: the confirmation asked before a
// document with lines changes currency, the conversion of its amounts, the fixed-rate
// currencies in the switch; and with the entry models and the line import. Until
// then these handlers do the least that keeps a document right: the currency and
// rate of a document are set from the currency service, a currency change on a
// document that has lines is refused as not handled yet, and models and imports add
// no lines.
#include "entry/gestion.h"

#include "host/currency.h"
#include "host/error.h"

namespace entry {

// ---------------------------------------------------------------------------- entry models, line import

// To be completed: copies the duplicated operation's lines and analytic rows.
void EntryScreen::importation_lignes(Evt*) {}
// To be completed: checks the model code and runs "MODTE_GENERER".
void EntryScreen::v_cmodel(Evt*) {}
void EntryScreen::v_cmodel_choisir(Evt*) { procedure("MODTE_CHOISIR"); }
// To be completed: the model choice window.
void EntryScreen::modte_choisir(Evt*) {}
// To be completed: replaces the lines by the model's.
void EntryScreen::modte_generer(Evt*) {}

// ---------------------------------------------------------------------------- currency

void EntryScreen::monnaie_choisir(Evt*) {
  if (enVisualisation()) {
    messageOk("Opération interdite en mode visualisation !");
    return;
  }
  if (lineInEntry()) {
    messageOk("Le changement de devise est interdit en cours de saisie de ligne !");
    return;
  }
  // To be completed: the currency choice window.
}

void EntryScreen::monnaie_ident(Evt* e) {
  if (MIRVAE_MONNAIE_IDENT.estVide()) return refuser(e, "La saisie d'une monnaie est obligatoire !", "MONNAIE_IDENT");
  Chaine devise(MIRVAE_MONNAIE_IDENT.chaine());
  Date date(MIRVAE_DTOPE.jour());
  Double taux(0);
  Chaine options("QRB");
  EvtParamRef bascule(4, &devise, &date, &taux, &options);
  procedure("CTRL_BASCULER", &bascule);
}

void EntryScreen::cours(Evt*) {
  euro().saisirCours(MIRVAE_MONNAIE_IDENT.chaine(), MIRVAE_DTOPE.jour(), MIRVAE_COURS.decimal());
  Chaine devise(MIRVAE_MONNAIE_IDENT.chaine());
  Date date(MIRVAE_DTOPE.jour());
  Double taux(0);
  Chaine options("DB");
  EvtParamRef bascule(4, &devise, &date, &taux, &options);
  procedure("CTRL_BASCULER", &bascule);
  ecran()->affiche("COURS", "");
}

// Parameters: currency (empty: the service's current one), date of the rate, rate
// (0: the rate of that day), option letters.
void EntryScreen::ctrl_basculer(Evt* e) {
  // PIDENT is also the screen's launch parameter: the local goes by another name here.
  Chaine devise("PIDENT", "", "", 4, this), PINFOS("PINFOS", "", "", 4, this);
  Date PDATE("PDATE", "", "", 4, this);
  Double PCOURS("PCOURS", "", "", 4, this);
  e->param(0, devise, 0);
  e->param(1, PDATE, 0);
  e->param(2, PCOURS, 0);
  e->param(3, PINFOS, 0);
  Devises& devises = euro();
  if (devise.estVide()) devise = devises.courante();
  ecran()->affiche("MONNAIE_IDENT", "TBL_MONNAIE", "");
  if (PINFOS.estVide() && !enVisualisation()) PINFOS = "QRB";

  // To be completed: the switch converts the amounts of a document that has lines,
  // after the user confirmed. Until it does, such a change is refused whole.
  MEM_MIRVAL.initRequete();
  if (PINFOS.position("Q") > 0 && devise.chaine() != devises.courante() && MEM_MIRVAL.nombre() > 0)
    throw HostError("le changement de devise d'une pièce qui a déjà des lignes n'est pas encore possible");

  devises.definirCourante(devise.chaine(), PDATE.jour(), PCOURS.decimal());
  Automate::ctrl_basculer(e);
  MIRVAE_MONNAIE_IDENT = devises.courante();
  PCOURS = devises.coursCourant();
  MIRVAE_COURS = devises.coursCourant();
  if (devises.estCoursFixe(MIRVAE_MONNAIE_IDENT.chaine()))
    ecran()->interdit("COURS", "");
  else
    ecran()->autorise("COURS", "");
  ecran()->affiche("COURS", "");
}

// To be completed with the currency switch (confirmation, conversion).
void EntryScreen::ctrl_actualiser_mode(Evt* e) { Saisie::ctrl_actualiser_mode(e); }

// To be completed with the currency switch (new pair, amounts in memory).
void EntryScreen::ctrl_actualiser_bascule(Evt* e) { Automate::ctrl_actualiser_bascule(e); }

void EntryScreen::actualiser_info_monetaires(Evt*) {
  EvtParamRef devise(1, &MIRVAE_MONNAIE_IDENT);
  appelerProcedure("*1", "MONNAIE", "INTERFACE", "LECTURE", &devise, -1);
  ecran()->affiche("LST", "GRP_TOT", "");
}

// The conversion pair: the entry currency towards the accounting currency, or the
// keeping currency when that is not the reference currency.
void EntryScreen::definir_bascule(Evt*) {
  Devises& devises = euro();
  bool reference = devises.estReference(PARAM_MONNAIE_IDENT.chaine());
  const Champ& cible = reference ? PARAM_MONNAIE_CMP_IDENT : PARAM_MONNAIE_IDENT;
  devises.definirBascule(MIRVAE_MONNAIE_IDENT.chaine(), cible.chaine());
}

}  // namespace entry
