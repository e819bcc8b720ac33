// The currency of the operation and its rate.
//
// An operation is entered in one currency at one rate; its amounts are in that
// currency. The currency service of the session holds the current currency of the
// document on screen; every change goes through the host's currency switch
// ("CTRL_BASCULER"), which asks this screen whether the change may be made
// ("CTRL_ACTUALISER_MODE": never while a line is typed, and only once the user
// confirmed for a document that has lines), converts the document's amounts, then
// lets the screen catch up ("CTRL_ACTUALISER_BASCULE").
//
// Option letters of the switch: "D" the document as it stands (a record opened or
// copied, a rate typed): its amounts are already in the currency and are not
// converted, and without a rate given it keeps its own; "Q" ask before converting a
// document that has lines; "R" take the currency into the header; "B" define the
// conversion pair again.
#include "entry/gestion.h"

#include "model/child_rows.h"

#include "host/currency.h"
#include "host/error.h"

namespace entry {

namespace {

bool option(const Donnee& options, char letter) { return options.chaine().find(letter) != std::string::npos; }

}  // namespace

// Runs "CTRL_BASCULER" for the operation's currency at its date, with `options`.
void EntryScreen::switchCurrency(const char* options) {
  Chaine devise(MIRVAE_MONNAIE_IDENT.chaine());
  Date date(MIRVAE_DTOPE.jour());
  Double taux(0);
  Chaine lettres(options);
  EvtParamRef bascule(4, &devise, &date, &taux, &lettres);
  procedure("CTRL_BASCULER", &bascule);
}

bool EntryScreen::hasLines() {
  MEM_MIRVAL.initRequete();
  return MEM_MIRVAL.nombre() > 0;
}

void EntryScreen::monnaie_choisir(Evt* e) {
  if (enVisualisation()) {
    messageOk("Opération interdite en mode visualisation !");
    return;
  }
  if (lineInEntry()) {
    messageOk("Le changement de devise est interdit en cours de saisie de ligne !");
    return;
  }
  // The window writes its pick into its parameter: the header keeps its currency
  // until the switch accepts the new one.
  Chaine devise(MIRVAE_MONNAIE_IDENT.chaine());
  EvtParamRef choix(1, &devise);
  appelerProcedure("*", "MONNAIE", "INTERFACE", "CHOIX", &choix, -1);
  int code = erreurMethode();
  erreurMethode(code, e);
  if (code == 2) {
    controler("MONNAIE_IDENT");
    rejeter(e);
    return;
  }
  if (code != 0) return;
  I_MONNAIE.initRequete();
  I_MONNAIE.activeRequete();
  if (I_MONNAIE.suivant(3) != 0) throw HostError("la monnaie choisie n'a pas été lue dans I_MONNAIE");
  MIRVAE_MONNAIE_IDENT = I_MONNAIE_IDENT;
  switchCurrency("QRB");
  erreurMethode(erreurMethode(), e);
}

void EntryScreen::monnaie_ident(Evt* e) {
  if (MIRVAE_MONNAIE_IDENT.estVide()) return refuser(e, "La saisie d'une monnaie est obligatoire !", "MONNAIE_IDENT");
  switchCurrency("QRB");
  // A change declined or refuseded puts the currency typed back.
  if (erreurMethode() != 0) {
    controler("MONNAIE_IDENT");
    rejeter(e);
  }
}

void EntryScreen::cours(Evt*) {
  euro().saisirCours(MIRVAE_MONNAIE_IDENT.chaine(), MIRVAE_DTOPE.jour(), MIRVAE_COURS.decimal());
  switchCurrency("DB");
  ecran()->affiche("COURS", "");
}

namespace {

// The parameters of the currency switch and of the steps it runs, read as locals of
// the screen: currency (empty: the service's current one), date of the rate, rate (0:
// the rate of that day), option letters. PIDENT is also the screen's launch
// parameter: the currency goes by another name here.
struct SwitchParameters {
  SwitchParameters(Automate* screen, Evt* e)
      : devise("PIDENT", "", "", 4, screen),
        PDATE("PDATE", "", "", 4, screen),
        PCOURS("PCOURS", "", "", 4, screen),
        PINFOS("PINFOS", "", "", 4, screen) {
    e->param(0, devise, 0);
    e->param(1, PDATE, 0);
    e->param(2, PCOURS, 0);
    e->param(3, PINFOS, 0);
  }
  Chaine devise;
  Date PDATE;
  Double PCOURS;
  Chaine PINFOS;
};

}  // namespace

void EntryScreen::ctrl_basculer(Evt* e) {
  SwitchParameters p(this, e);
  auto& [devise, PDATE, PCOURS, PINFOS] = p;
  Devises& devises = euro();
  if (devise.estVide()) devise = devises.courante();
  ecran()->affiche("MONNAIE_IDENT", "TBL_MONNAIE", "");
  if (PINFOS.estVide() && !enVisualisation()) PINFOS = "QRB";
  // A saved operation keeps the rate it was entered at, not the rate of the day.
  if (option(PINFOS, 'D') && PCOURS.decimal().isZero() && devise == MIRVAE_MONNAIE_IDENT &&
      MIRVAE_COURS.decimal().sign() > 0 && !devises.estCoursFixe(devise.chaine()))
    PCOURS = MIRVAE_COURS.decimal();

  EvtParamRef bascule(4, &devise, &PDATE, &PCOURS, &PINFOS);
  Automate::ctrl_basculer(&bascule);
  int refused = erreurMethode();
  // Declined or refused, the switch left the service as it was: the header shows
  // the currency and rate the document keeps.
  MIRVAE_MONNAIE_IDENT = devises.courante();
  if (refused == 0) PCOURS = devises.coursCourant();
  MIRVAE_COURS = devises.coursCourant();
  if (devises.estCoursFixe(MIRVAE_MONNAIE_IDENT.chaine()))
    ecran()->interdit("COURS", "");
  else
    ecran()->autorise("COURS", "");
  ecran()->affiche("COURS", "");
  erreurMethode(refused, e);
}

void EntryScreen::ctrl_actualiser_mode(Evt* e) {
  SwitchParameters p(this, e);
  auto& [devise, PDATE, PCOURS, PINFOS] = p;
  if (!enVisualisation() && lineInEntry()) return erreurMethode(1, e);

  Devises& devises = euro();
  if (option(PINFOS, 'Q') && devise.chaine() != devises.courante() && hasLines()) {
    EvtParamRef question(2, "Confirmez-vous le changement de devise et le recalcul de la pièce ?", &V_CHOIX);
    compta("MESS_ON", &question);
    if (V_CHOIX != "1") return erreurMethode(1, e);
  }
  devises.definirCourante(devise.chaine(), PDATE.jour(), PCOURS.decimal());
  MIRVAE_MONNAIE_IDENT = devises.courante();
  procedure("ACTUALISER_INFO_MONETAIRES");
  erreurMethode(0, e);
}

void EntryScreen::ctrl_actualiser_bascule(Evt* e) {
  Chaine PINFOS("PINFOS", "", "", 4, this);
  e->param(3, PINFOS, 0);
  if (option(PINFOS, 'R')) MIRVAE_MONNAIE_IDENT = euro().courante();
  if (option(PINFOS, 'B')) procedure("DEFINIR_BASCULE");
  procedure("MAJ_LIGNES_MEMOIRE");
  procedure("ACTUALISER_INFO_MONETAIRES");
  Automate::ctrl_actualiser_bascule(e);
}

void EntryScreen::convertAmounts(const std::function<Decimal(const Decimal&)>& convert) {
  Automate::convertAmounts(convert);
  MEM_MIRVAL.initRequete();
  MEM_MIRVAL.activeRequete();
  for (int rc = MEM_MIRVAL.suivant(3); rc == 0; rc = MEM_MIRVAL.suivant(1)) {
    std::string ident = MEM_MIRVAL.valeur("IDENT").chaine();
    // A line without identifier has no analytic rows yet; its empty prefix would
    // select every row.
    if (ident.empty()) continue;
    model::convertChildRows(MIRVAANA_M01, MIRVAANA_M01_NUMERO, ident, {&MIRVAANA_M01_MTADE, &MIRVAANA_M01_MTACR},
                            convert);
    for (Part* part : parts_) part->amountsConverted(ident, convert);
  }
  MEM_MIRVAL.initRequete();
  for (Part* part : parts_) part->amountsConverted("", convert);
}

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
