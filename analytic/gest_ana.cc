#include "analytic/gest_ana.h"

#include "host/currency.h"
#include "host/error.h"
#include <algorithm>
#include <vector>

#include "host/session.h"

namespace analytic {

namespace {
constexpr const char* kPosts = "CPPOANA";
constexpr const char* kKeys = "CPCRITA";
constexpr const char* kSections = "CPSECAN";
constexpr const char* kSectionColumn = "LST_MIRVAANA_M01.CSECT";
}  // namespace

MIRVAEGest_ana::MIRVAEGest_ana(Evt* e) : Gestion_document2(e) {
  Evt* launch = lancement();
  Donnee* params[] = {&PIDENT, &PMODE, &P_DTOPE, &P_COURS, &P_CPOST, &P_CCRIT,
                      &P_CSECT, &P_MTDEBS, &P_MTCRES, &P_SIGNE, &P_SAISIE_OBLIGATOIRE};
  int count = std::min<int>(launch->nbParams(), std::size(params));
  // The post and the key go back to the caller; the rest is read once.
  for (int i = 0; i < count; ++i) launch->param(i, *params[i], params[i] == &P_CPOST || params[i] == &P_CCRIT);
  nomBase("CP");
  nomLibelles("LIBE1", "LIBEL");
  nomEcran("+GEST_ANA");
  modeSaisie(PMODE);
  nomTable("MIRVAL_M01", nullptr);
  configureDocument("P1,LST", "LST", "MIRVAANA_M01");

  addBranch("INIT", [this](Evt* ev) { init(ev); });
  addBranch("DEBUT", [this](Evt* ev) { debut(ev); });
  addBranch("V_CPOST", &MIRVAEGest_ana::v_cpost);
  addBranch("CPPOANA_CHOISIR", &MIRVAEGest_ana::cppoana_choisir);
  addBranch("V_CCRIT", &MIRVAEGest_ana::v_ccrit);
  addBranch("CPCRITA_CHOISIR", &MIRVAEGest_ana::cpcrita_choisir);
  addBranch("SELECTION", [this](Evt* ev) { selection(ev); });
  addBranch("CTRL_DEBUT_LIGNE", [this](Evt* ev) { ctrl_debut_ligne(ev); });
  addBranch("DEBUT_CREATION_LIGNE", [this](Evt* ev) { debut_creation_ligne(ev); });
  addBranch("LST_MIRVAANA_M01.CSECT", &MIRVAEGest_ana::lst_mirvaana_m01_csect);
  addBranch("CPSECAN_CHOISIR", &MIRVAEGest_ana::cpsecan_choisir);
  addBranch("VALIDATION", [this](Evt* ev) { validation(ev); });
  addBranch("APRES_VALIDATION", [this](Evt* ev) { apres_validation(ev); });
  addBranch("B_ABAND_DOC", &MIRVAEGest_ana::b_aband_doc);
  addBranch("APRES_ABANDON", [this](Evt* ev) { apres_abandon(ev); });
  addBranch("VALIDATION_LIGNE", [this](Evt* ev) { validation_ligne(ev); });
  addBranch("APRES_VALIDATION_LIGNE", [this](Evt* ev) { apres_validation_ligne(ev); });
  addBranch("APRES_SUPPRESSION_LIGNE", [this](Evt* ev) { apres_suppression_ligne(ev); });
  addBranch("BT_SOLDE", &MIRVAEGest_ana::bt_solde);
  addBranch("CALCUL_TOTAL_VENTILE", &MIRVAEGest_ana::calcul_total_ventile);
  addBranch("SECTIONS_PAR_CLE", &MIRVAEGest_ana::sections_par_cle);
  addBranch("CREAT_VENTILATION_AUTO", &MIRVAEGest_ana::creat_ventilation_auto);
  addBranch("MODIF_VENTILATION_AUTO", &MIRVAEGest_ana::modif_ventilation_auto);
  addBranch("CTRL_CHOISIR", [this](Evt* ev) { ctrl_choisir(ev); });
}

// ---------------------------------------------------------------------------- helpers

void MIRVAEGest_ana::messageOk(const std::string& text) {
  EvtParamVal message(1, text);
  appelerProcedure("*", "CPMESSAG", "INTERFACE", "MESS_OK", &message, -1);
}

void MIRVAEGest_ana::refuser(Evt* e, const std::string& message, const char* control) {
  messageOk(message);
  controler(control);
  rejeter(e);
  erreurMethode(1, e);
}

bool MIRVAEGest_ana::lire(const char* module, const char* procedure, Donnee& code, Table& record) {
  EvtParamRef param(1, &code);
  appelerProcedure("*1", module, "INTERFACE", procedure, &param, -1);
  bool found = erreurMethode() == 0;
  record.initRequete();
  record.activeRequete();
  if (!found || record.suivant(3) != 0) {
    record.raz();
    return false;
  }
  return true;
}

void MIRVAEGest_ana::nouvelIdentifiant(Donnee& ident) {
  Entier largeur(8);
  EvtParamRef params(6, "CP", "NDOC", "MIRVAANA", "", &largeur, &ident);
  appelerProcedure("*", "ZEFNDOC", "INTERFACE", "ATTRIBUE_NUMERO", &params, -1);
  appelerProcedure("*", "ZEFNDOC", "INTERFACE", "VALIDE_NUMERO", &params, -1);
}

void MIRVAEGest_ana::openForChange() {
  // The screen opens in modification: only a model that asks for the change to be
  // announced gets it.
  if (aBranche("CTRL_DEBUT_MODIF")) appelerProcedure("", "", "", "CTRL_DEBUT_MODIF", nullptr, 0);
}

void MIRVAEGest_ana::selectStoredRows() {
  MIRVAANA_M01.initRequete();
  MIRVAANA_M01.ajouteFiltre(MIRVAANA_M01_NUMERO, '/', PIDENT.chaine() + "|");
  MIRVAANA_M01.activeRequete();
}

void MIRVAEGest_ana::selectImage(Table& image) {
  image.initRequete();
  image.activeRequete();
}

// ---------------------------------------------------------------------------- start

void MIRVAEGest_ana::init(Evt* e) { Gestion_document::init(e); }

void MIRVAEGest_ana::debut(Evt* e) {
  if (PARAM.lit(3, PARAM_PNUME, '=', Valeur::entier(1)) != 0) {
    messageOk(libelle("0028"));
    Message::nettoie(this);
    sortir(e, 0);
    return;
  }
  EvtParamRef devise(1, &PARAM_MONNAIE_IDENT);
  appelerProcedure("*1", "MONNAIE", "INTERFACE", "LECTURE", &devise, -1);
  Automate::debut(e);
  // The amounts come in the currency of the line's operation, already in force.
  Chaine courante(session().devises() ? session().devises()->courante() : PARAM_MONNAIE_IDENT.chaine());
  Chaine options("D");
  EvtParamRef bascule(4, &courante, &P_DTOPE, &P_COURS, &options);
  appelerProcedure("", "", "", "CTRL_BASCULER", &bascule, 0);

  V_MTLIG = (P_MTDEBS.decimal() + P_MTCRES.decimal()) * Decimal(P_SIGNE.entier());
  V_CPOST = P_CPOST;
  V_CCRIT = P_CCRIT;
  if (P_CPOST.chaine().empty()) I_CPPOANA.raz();
  else lire(kPosts, "LECTURE", V_CPOST, I_CPPOANA);
  if (P_CCRIT.chaine().empty()) I_CPCRITA.raz();
  else lire(kKeys, "LECTURE", V_CCRIT, I_CPCRITA);

  table(false)->initRequete();
  table(false)->ajouteFiltre(MIRVAL_M01_IDENT, '=', PIDENT);
  table(false)->activeRequete();
  selectStoredRows();
  if (MIRVAANA_M01.suivant(3) == 0) {
    appelerProcedure("", "", "", "MODIF_VENTILATION_AUTO", nullptr, 0);
  } else if (!I_CPCRITA_IDENT.chaine().empty()) {
    appelerProcedure("", "", "", "CREAT_VENTILATION_AUTO", nullptr, 0);
  } else if (!P_CSECT.chaine().empty()) {
    MIRVAANA_M01.raz();
    nouvelIdentifiant(MIRVAANA_M01_IDENT);
    MIRVAANA_M01_NUMERO = PIDENT.chaine() + "|" + MIRVAANA_M01_IDENT.chaine();
    MIRVAANA_M01_CSECT = P_CSECT;
    MIRVAANA_M01_MTADE = P_MTDEBS;
    MIRVAANA_M01_MTACR = P_MTCRES;
    MIRVAANA_M01.ecrit();
  }
  MIRVAANA_M01.raz();
  appelerProcedure("", "", "", "CALCUL_TOTAL_VENTILE", nullptr, 0);
}

// ---------------------------------------------------------------------------- totals

void MIRVAEGest_ana::calcul_total_ventile(Evt*) {
  Decimal debit, credit;
  auto add = [&](Table& rows, Champ& mtade, Champ& mtacr) {
    for (int rc = rows.suivant(3); rc == 0; rc = rows.suivant(1)) {
      debit += mtade.decimal();
      credit += mtacr.decimal();
    }
  };
  selectImage(MEM_MIRVAANA);
  // Before the document is shown its rows are only stored; once it is, the image
  // is the breakdown, even when the user deleted every row of it.
  if (MEM_MIRVAANA.nombre() > 0 || !modeCourant().empty()) {
    add(MEM_MIRVAANA, MEM_MIRVAANA_MTADE, MEM_MIRVAANA_MTACR);
  } else {
    Table stored(this, "", "MIRVAANA_M01", "MIRVAANA_TOTAL");
    Champ numero("NUMERO", &stored), mtade("MTADE", &stored), mtacr("MTACR", &stored);
    stored.initRequete();
    stored.ajouteFiltre(numero, '/', PIDENT.chaine() + "|");
    stored.activeRequete();
    add(stored, mtade, mtacr);
  }
  V_TOT_DEBS = debit;
  V_TOT_CRES = credit;
  V_RESTE_DEBS = P_MTDEBS.decimal() - debit;
  V_RESTE_CRES = P_MTCRES.decimal() - credit;
  Decimal sign(P_SIGNE.entier());
  V_TOT_ANA = (debit + credit) * sign;
  V_RESTE_ANA = (V_RESTE_DEBS.decimal() + V_RESTE_CRES.decimal()) * sign;
  ecran()->affiche("CHAMP_PIED", "");
}

// ---------------------------------------------------------------------------- rows

void MIRVAEGest_ana::selection(Evt*) {
  lire(kSections, "LECTURE", MIRVAANA_M01_CSECT, I_CPSECAN);
  V_MTANA = (MIRVAANA_M01_MTADE.decimal() + MIRVAANA_M01_MTACR.decimal()) * Decimal(P_SIGNE.entier());
}

void MIRVAEGest_ana::ctrl_debut_ligne(Evt* e) {
  Sdocum::ctrl_debut_ligne(e);
  selection(e);
  ecran()->autorise("BT_SOLDE", "");
  // A closed section's row keeps its amount.
  if (I_CPSECAN_SCLOT == "O")
    ecran()->interdit("LST_MIRVAANA_M01.MTADE", "LST_MIRVAANA_M01.MTACR", "LST_V_MTANA", "BT_SOLDE", "");
  else
    ecran()->autorise("LST_MIRVAANA_M01.MTADE", "LST_MIRVAANA_M01.MTACR", "LST_V_MTANA", "");
}

void MIRVAEGest_ana::debut_creation_ligne(Evt* e) {
  Sdocum::debut_creation_ligne(e);
  V_MTANA = Decimal();
  ecran()->interdit("BT_SOLDE", "");
}

void MIRVAEGest_ana::lst_mirvaana_m01_csect(Evt* e) {
  std::string section = MIRVAANA_M01_CSECT.chaine();
  if (!lire(kSections, "LECTURE", MIRVAANA_M01_CSECT, I_CPSECAN) && !section.empty())
    return refuser(e, "La section est inexistante !", kSectionColumn);
  ecran()->fonction(20, "LST");
  if (section.empty()) return;
  selectImage(MEM_MIRVAANA2);
  for (int rc = MEM_MIRVAANA2.suivant(3); rc == 0; rc = MEM_MIRVAANA2.suivant(1))
    if (MEM_MIRVAANA2_NUMERO.chaine() != MIRVAANA_M01_NUMERO.chaine() && MEM_MIRVAANA2_CSECT.chaine() == section)
      return refuser(e, "La section a déjà été saisie !", kSectionColumn);
  if (I_CPSECAN_CLOAN != "O") {
    if (I_CPSECAN_SCLOT == "O") return refuser(e, "Cette section est clôturée...Saisie impossible !", kSectionColumn);
    if (!I_CPSECAN_DTOUV.estVide() && I_CPSECAN_DTOUV > P_DTOPE)
      return refuser(e,
                     "La date d'ouverture de la section est postérieure à la date d'opération...Saisie impossible !",
                     kSectionColumn);
    if (!I_CPSECAN_DTCLO.estVide() && I_CPSECAN_DTCLO < P_DTOPE)
      return refuser(e, "La date de clôture de la section est antérieure à la date d'opération...Saisie impossible ",
                     kSectionColumn);
  }
  ecran()->autorise("BT_SOLDE", "");
}

void MIRVAEGest_ana::validation_ligne(Evt* e) {
  if (MIRVAANA_M01_CSECT.chaine().empty())
    return refuser(e, "La saisie d'une section est obligatoire !", kSectionColumn);
  Decimal amount = V_MTANA.decimal() * Decimal(P_SIGNE.entier());
  MIRVAANA_M01_MTADE = debitMovement() ? amount : Decimal();
  MIRVAANA_M01_MTACR = debitMovement() ? Decimal() : amount;
  if (MIRVAANA_M01_MTADE == 0 && MIRVAANA_M01_MTACR == 0)
    return refuser(e, "La saisie d'un montant est obligatoire !", kSectionColumn);
  if (MIRVAANA_M01_IDENT.chaine().empty()) nouvelIdentifiant(MIRVAANA_M01_IDENT);
  Sdocum::validation_ligne(e);
}

void MIRVAEGest_ana::apres_validation_ligne(Evt*) {
  appelerProcedure("", "", "", "CALCUL_TOTAL_VENTILE", nullptr, 0);
}

void MIRVAEGest_ana::apres_suppression_ligne(Evt*) {
  appelerProcedure("", "", "", "CALCUL_TOTAL_VENTILE", nullptr, 0);
}

void MIRVAEGest_ana::bt_solde(Evt*) {
  if (MIRVAANA_M01_CSECT.chaine().empty()) return;
  Monnaie V_SOLDE_DEB("V_SOLDE_DEB", "", "", 4, this), V_SOLDE_CRE("V_SOLDE_CRE", "", "", 4, this);
  Decimal debit, credit;
  selectImage(MEM_MIRVAANA2);
  for (int rc = MEM_MIRVAANA2.suivant(3); rc == 0; rc = MEM_MIRVAANA2.suivant(1)) {
    if (MEM_MIRVAANA2_NUMERO.chaine() == MIRVAANA_M01_NUMERO.chaine()) continue;
    debit += MEM_MIRVAANA2_MTADE.decimal();
    credit += MEM_MIRVAANA2_MTACR.decimal();
  }
  V_SOLDE_DEB = debit;
  V_SOLDE_CRE = credit;
  EvtParamVal liste(1, "LST");
  appelerProcedure("", "", "", "CTRL_DEBUT_MODIF_LISTE", &liste, 0);
  // What the other rows already cover is never taken back from this one.
  if (debitMovement())
    MIRVAANA_M01_MTADE = V_SOLDE_DEB >= P_MTDEBS ? Decimal() : P_MTDEBS.decimal() - debit;
  else
    MIRVAANA_M01_MTACR = V_SOLDE_CRE >= P_MTCRES ? Decimal() : P_MTCRES.decimal() - credit;
  V_MTANA = (MIRVAANA_M01_MTADE.decimal() + MIRVAANA_M01_MTACR.decimal()) * Decimal(P_SIGNE.entier());
  ecran()->fonction(20, "LST");
}

// ---------------------------------------------------------------------------- document

void MIRVAEGest_ana::validation(Evt* e) {
  bool brokenDown = V_TOT_DEBS != 0 || V_TOT_CRES != 0;
  bool remains = V_RESTE_DEBS != 0 || V_RESTE_CRES != 0;
  if (brokenDown && remains) return refuser(e, "Le total ventilé est différent du montant du mouvement !", "LST");
  if (P_SAISIE_OBLIGATOIRE == "O" && I_CPPOANA_IDENT.chaine().empty() && (P_MTDEBS != 0 || P_MTCRES != 0))
    return refuser(e, "La saisie de la ventilation analytique est obligatoire pour ce compte !", "V_CPOST");
  Gestion_document2::validation(e);
}

void MIRVAEGest_ana::apres_validation(Evt*) {
  P_CPOST = V_CPOST;
  P_CCRIT = V_CCRIT;
}

void MIRVAEGest_ana::b_aband_doc(Evt* e) {
  if (consultation()) {
    sortir(e, 0);
    return;
  }
  appelerProcedure("", "", "", "ABAND_DOC", nullptr, 0);
}

void MIRVAEGest_ana::apres_abandon(Evt* e) {
  Sdocum::apres_abandon(e);
  V_CPOST = P_CPOST;
  lire(kPosts, "LECTURE", V_CPOST, I_CPPOANA);
  V_CCRIT = P_CCRIT;
  lire(kKeys, "LECTURE", V_CCRIT, I_CPCRITA);
  ecran()->affiche("P1", "");
}

void MIRVAEGest_ana::ctrl_choisir(Evt* e) {
  if (e && e->nbParams() > 0 && e->parametre(0).chaine() == kSectionColumn) {
    appelerProcedure("", "", "", "CPSECAN_CHOISIR", nullptr, 0);
    return;
  }
  Gestion_document2::ctrl_choisir(e);
}

// ---------------------------------------------------------------------------- posts, keys, sections

void MIRVAEGest_ana::v_cpost(Evt* e) {
  if (!lire(kPosts, "LECTURE", V_CPOST, I_CPPOANA) && !V_CPOST.chaine().empty())
    return refuser(e, "Le poste est inexistant !", "V_CPOST");
  ecran()->affiche("TBL_POANA", "");
}

void MIRVAEGest_ana::v_ccrit(Evt* e) {
  if (!lire(kKeys, "LECTURE", V_CCRIT, I_CPCRITA) && !V_CCRIT.chaine().empty())
    return refuser(e, "La clé de répartition est inexistante !", "V_CCRIT");
  ecran()->affiche("TBL_CRITA", "");
}

void MIRVAEGest_ana::cppoana_choisir(Evt*) {
  if (consultation()) return messageOk("Opération interdite en mode visualisation !");
  lire(kPosts, "CHOIX", V_CPOST, I_CPPOANA);
  openForChange();
  if (I_CPPOANA_LPOST.chaine().empty()) {
    I_CPPOANA.raz();
    V_CPOST = "";
  }
  ecran()->affiche("V_CPOST", "TBL_POANA", "");
}

void MIRVAEGest_ana::cpcrita_choisir(Evt*) {
  if (consultation()) return messageOk("Opération interdite en mode visualisation !");
  lire(kKeys, "CHOIX", V_CCRIT, I_CPCRITA);
  openForChange();
  if (I_CPCRITA_LCRIT.chaine().empty()) {
    I_CPCRITA.raz();
    V_CCRIT = "";
  }
  ecran()->affiche("V_CCRIT", "TBL_CRITA", "");
  appelerProcedure("", "", "", "SECTIONS_PAR_CLE", nullptr, 0);
  appelerProcedure("", "", "", "CALCUL_TOTAL_VENTILE", nullptr, 0);
  ecran()->affiche("LST", "");
}

void MIRVAEGest_ana::cpsecan_choisir(Evt* e) {
  if (consultation()) return messageOk("Opération interdite en mode visualisation !");
  lire(kSections, "CHOIX", MIRVAANA_M01_CSECT, I_CPSECAN);
  EvtParamVal liste(1, "LST");
  appelerProcedure("", "", "", "CTRL_DEBUT_MODIF_LISTE", &liste, 0);
  if (I_CPSECAN_LSECT.chaine().empty()) MIRVAANA_M01_CSECT = "";
  appelerProcedure("", "", "", kSectionColumn, e, 0);
}

// ---------------------------------------------------------------------------- spreads

std::string MIRVAEGest_ana::keySectionRefusal(const std::string& section) {
  Chaine code(section);
  if (!lire(kSections, "LECTURE", code, I_CPSECAN)) return "La section " + section + " est inexistante !";
  if (I_CPSECAN_CLOAN == "O") return "";
  if (I_CPSECAN_SCLOT == "O") return "La section " + section + " est clôturée !";
  if (!I_CPSECAN_DTOUV.estVide() && I_CPSECAN_DTOUV > P_DTOPE)
    return "La date d'ouverture de la section " + section + " est postérieure à la date d'opération !";
  if (!I_CPSECAN_DTCLO.estVide() && I_CPSECAN_DTCLO < P_DTOPE)
    return "La date de clôture de la section " + section + " est antérieure à la date d'opération !";
  return "";
}

void MIRVAEGest_ana::spreadByKey(const std::function<void(const std::string&, const Decimal&)>& add) {
  Double TOT_VENTIL("TOT_VENTIL", "", "", 4, this);
  std::vector<std::pair<std::string, Decimal>> shares;
  Decimal total;
  VENSE.initRequete();
  VENSE.ajouteFiltre(VENSE_CCRIT, '=', I_CPCRITA_IDENT);
  VENSE.activeRequete();
  for (int rc = VENSE.suivant(3); rc == 0; rc = VENSE.suivant(1)) {
    shares.emplace_back(VENSE_CSECT.chaine(), VENSE_MTVEN.decimal());
    total += VENSE_MTVEN.decimal();
  }
  TOT_VENTIL = total;
  if (total == Decimal()) return;
  for (const auto& [section, share] : shares) {
    // A section without a share would give a row without amount, which no row may be.
    if (share == Decimal()) continue;
    std::string refusal = keySectionRefusal(section);
    if (!refusal.empty()) {
      messageOk(refusal);
      continue;
    }
    add(section, (movement() * share / total).rounded(2));
  }
}

void MIRVAEGest_ana::firstRowTakesRemainder(Table& rows, Champ& mtade, Champ& mtacr) {
  Double TOT_VENTIL_M("TOT_VENTIL_M", "", "", 4, this);
  Decimal spread;
  for (int rc = rows.suivant(3); rc == 0; rc = rows.suivant(1)) spread += mtade.decimal() + mtacr.decimal();
  TOT_VENTIL_M = spread;
  if (spread == movement() || rows.suivant(3) != 0) return;
  Champ& side = sideOf(mtade, mtacr);
  side = side.decimal() - (spread - movement());
  rows.ecrit();
}

void MIRVAEGest_ana::sections_par_cle(Evt*) {
  selectImage(MEM_MIRVAANA);
  MEM_MIRVAANA.vide();
  spreadByKey([this](const std::string& section, const Decimal& amount) {
    MIRVAANA_M01.raz();
    nouvelIdentifiant(MIRVAANA_M01_IDENT);
    MIRVAANA_M01_NUMERO = PIDENT.chaine() + "|";
    MIRVAANA_M01_CSECT = section;
    sideOf(MIRVAANA_M01_MTADE, MIRVAANA_M01_MTACR) = amount;
    appelerProcedure("", "", "", "AJOUTER_LIGNE", nullptr, 0);
  });
  appelerProcedure("", "", "", "RENUMEROTE_LIGNES", nullptr, 0);
  selectImage(MEM_MIRVAANA);
  firstRowTakesRemainder(MEM_MIRVAANA, MEM_MIRVAANA_MTADE, MEM_MIRVAANA_MTACR);
}

void MIRVAEGest_ana::creat_ventilation_auto(Evt*) {
  // Each row is stored under the line's prefix with an order of its own, its
  // identifier, so that the line's rows are found by that prefix and told apart.
  spreadByKey([this](const std::string& section, const Decimal& amount) {
    MIRVAANA_M01.raz();
    nouvelIdentifiant(MIRVAANA_M01_IDENT);
    MIRVAANA_M01_NUMERO = PIDENT.chaine() + "|" + MIRVAANA_M01_IDENT.chaine();
    MIRVAANA_M01_CSECT = section;
    sideOf(MIRVAANA_M01_MTADE, MIRVAANA_M01_MTACR) = amount;
    MIRVAANA_M01.ecrit();
  });
  selectStoredRows();
  firstRowTakesRemainder(MIRVAANA_M01, MIRVAANA_M01_MTADE, MIRVAANA_M01_MTACR);
}

void MIRVAEGest_ana::modif_ventilation_auto(Evt*) {
  Double V_TOT_VENTIL("V_TOT_VENTIL", "Total ventilation", "", 4, this);
  Double V_TOT_VENTIL_M("V_TOT_VENTIL_M", "", "", 4, this);
  Double V_DIF_VENTIL("V_DIF_VENTIL", "Différence entre ventilation et écriture", "", 4, this);
  Champ& side = sideOf(MIRVAANA_M01_MTADE, MIRVAANA_M01_MTACR);
  Champ& other = debitMovement() ? MIRVAANA_M01_MTACR : MIRVAANA_M01_MTADE;
  Decimal total;
  selectStoredRows();
  for (int rc = MIRVAANA_M01.suivant(3); rc == 0; rc = MIRVAANA_M01.suivant(1)) {
    if (other != 0) {
      side = other.decimal();
      other = Decimal();
      MIRVAANA_M01.ecrit();
    }
    total += side.decimal();
  }
  V_TOT_VENTIL = total;
  V_TOT_VENTIL_M = total;
  Decimal difference = total - movement();
  V_DIF_VENTIL = difference;
  if (difference == Decimal()) return;
  // Rows that total nothing have no proportion to keep: the first row takes it all.
  if (total != Decimal()) {
    for (int rc = MIRVAANA_M01.suivant(3); rc == 0; rc = MIRVAANA_M01.suivant(1)) {
      side = (movement() * side.decimal() / total).rounded(2);
      MIRVAANA_M01.ecrit();
    }
  }
  firstRowTakesRemainder(MIRVAANA_M01, MIRVAANA_M01_MTADE, MIRVAANA_M01_MTACR);
}

}  // namespace analytic
