#include "access/acces.h"

#include "host/error.h"
#include "host/session.h"
#include "model/interface.h"

namespace browser {

using namespace host;

MIRVAEAcces::MIRVAEAcces(Evt* e, const registry::OperationKind& kind) : Acces2(e), kind_(kind) {
  nomBase("CP");
  nomLibelles("LIBE1", "LIBEL");
  nomEcran(kind_.accessScreen().c_str());
  nomTable("MIRVAE", nullptr);
}

void MIRVAEAcces::registerBranches(const std::function<void()>& accountBranches) {
  addBranch("INIT", &MIRVAEAcces::init);
  addBranch("DEBUT_ACTIVATION", &MIRVAEAcces::debut_activation);
  addBranch("ACTIVE_REQUETE", &MIRVAEAcces::active_requete);
  addBranch("AVANT_DEBUT", &MIRVAEAcces::avant_debut);
  addBranch("DEBUT", &MIRVAEAcces::debut);
  addBranch("VMOIAN_SELECTION", &MIRVAEAcces::vmoian_selection);
  addBranch("VMOIAN", &MIRVAEAcces::vmoian);
  addBranch("VMOIAN_FERME", &MIRVAEAcces::vmoian_ferme);
  addBranch("CALCULER_DATES", &MIRVAEAcces::calculer_dates);
  addBranch("VDATE_DEBUT", &MIRVAEAcces::vdate_debut);
  addBranch("VDATE_FIN", &MIRVAEAcces::vdate_fin);
  addBranch("VIMPUT", &MIRVAEAcces::vimput);
  accountBranches();
  addBranch("VNPIEC_TOUS", &MIRVAEAcces::vnpiec_tous);
  addBranch("VNPIEC", &MIRVAEAcces::vnpiec);
  addBranch("LST_LISTE_VIDE", &MIRVAEAcces::lst_liste_vide);
  addBranch("LST_LISTE_PLEINE", &MIRVAEAcces::lst_liste_pleine);
  addBranch("LST_SELECTION", &MIRVAEAcces::lst_selection);
  addBranch("GERER", &MIRVAEAcces::gerer);
  addBranch("MODIFIER", &MIRVAEAcces::modifier);
  addBranch("CREER", &MIRVAEAcces::creer);
  addBranch("IMPR_FICHE", &MIRVAEAcces::impr_fiche);
  addBranch("IMPR_LISTE", &MIRVAEAcces::impr_liste);
  addBranch("CONTROLER_DOSSIER", &MIRVAEAcces::controler_dossier);
  addBranch("VISU_PIECE", &MIRVAEAcces::visu_piece);
}

// ---------------------------------------------------------------------------- helpers

void MIRVAEAcces::messageOk(const std::string& text) {
  EvtParamRef evt(1, text);
  appelerProcedure("*", "CPMESSAG", "INTERFACE", "MESS_OK", &evt, -1);
}

void MIRVAEAcces::refuseInput(Evt* e, const std::string& message, const char* control) {
  messageOk(message);
  controler(control, "");
  rejeter(e);
}

void MIRVAEAcces::quitter(Evt* e) {
  Message::nettoie(this);
  sortir(e, 0);
}

std::string MIRVAEAcces::anneeMoisNouvelExercice() { return host::yearMonth(DATE_DEBUT_NOUVEL_E.jour()); }

// ---------------------------------------------------------------------------- start

void MIRVAEAcces::init(Evt* e) { Acces::init(e); }

void MIRVAEAcces::avant_debut(Evt* e) {
  Entier FLAG_VERIF_DOS("FLAG_VERIF_DOS", "Les paramètres du dossier sont-ils corrects ? 0/1", "", 4, nullptr);
  EvtParamRef evt(1, &FLAG_VERIF_DOS);
  appelerProcedure("COMPTA", "COMPTA", "MOD_CAL_BIBLIOPROC", "VERIF_DOSSIER", &evt, -1);
  if (FLAG_VERIF_DOS == 0) {
    quitter(e);
    return;
  }
  Acces2::avant_debut(e);
}

void MIRVAEAcces::debut(Evt* e) {
  PARAM.raz();
  if (PARAM.lit(3, PARAM_PNUME, '=', Valeur::entier(1)) != 0) {
    messageOk(libelle("0028"));
    quitter(e);
    return;
  }
  if (PARAM_PRE18 != "O") {
    messageOk("L'option < Gestion simplifiée des opérations > n'est pas active !");
    quitter(e);
    return;
  }
  DATE_CLOTURE = PARAM_PDTCL;
  {
    EvtParamRef evt(2, &PARAM_PDFEX, &DATE_DEBUT_NOUVEL_E);
    appelerProcedure("COMPTA", "COMPTA", "MOD_CAL_BIBLIOPROC", "CALCUL_DATE_NOUVEL_EX", &evt, -1);
  }
  {
    EvtParamRef evt(3, &PARAM_PDDEX, &DATE_DEBUT_NOUVEL_E, &DATE_CLOTURE);
    appelerProcedure("COMPTA", "COMPTA", "MOD_CAL_BIBLIOPROC", "TABLE_ANNEE_MOIS", &evt, -1);
  }

  // The period combo: every year-month of the dossier, then no period, then the
  // two exercises.
  const Valeur nouvelExercice = Valeur::entier(std::stoll(anneeMoisNouvelExercice()));
  MEM04.initRequete();
  MEM04.vide();
  MEM02.initRequete();
  MEM02.activeRequete();
  for (int rc = MEM02.suivant(3); rc == 0; rc = MEM02.suivant(1)) {
    MEM04.raz();
    MEM04_ANMOI = MEM02_ANMOI;
    int order = comparer(Valeur::entier(MEM02_ANMOI.entier()), nouvelExercice);
    MEM04_EXERCICE = order < 0 ? "N" : "N+1";
    MEM04_MOIAN = MEM02_ANMOI(5, 6) + "/" + MEM02_ANMOI(1, 4);
    MEM04.ecrit();
  }
  MEM04.raz();
  MEM04_ANMOI = "";
  MEM04.ecrit();
  for (const char* exercice : {"N", "N+1"}) {
    MEM04.raz();
    MEM04_ANMOI = std::string(" Exercice ") + exercice;
    MEM04_MOIAN = std::string(" Exercice ") + exercice;
    MEM04_EXERCICE = exercice;
    MEM04.ecrit();
  }
  MEM04.initRequete();
  MEM04.activeRequete();

  appelerProcedure("", "", "", "CALCULER_DATES", nullptr, 0);
  openAccounts();

  VNPIEC_TOUS = "O";
  Automate::debut(e);
}

// ---------------------------------------------------------------------------- period

void MIRVAEAcces::vmoian_selection(Evt*) {
  // Rows after the new exercise's first month overlap it; the three rows without a
  // month compare as 0 and so are never overlapping.
  long long anmoi = 0;
  try {
    anmoi = MEM04_ANMOI.entier();
  } catch (const HostError&) {
    anmoi = 0;
  }
  MOANO_CHEV = anmoi > std::stoll(anneeMoisNouvelExercice()) ? "O" : "N";
}

void MIRVAEAcces::vmoian(Evt*) {
  appelerProcedure("", "", "", "CALCULER_DATES", nullptr, 0);
  ecran()->affiche("GRP1", "");
  requery();
}

void MIRVAEAcces::vmoian_ferme(Evt* e) { vmoian(e); }

void MIRVAEAcces::calculer_dates(Evt*) {
  if (VMOIAN == "") {
    VDATE_MIN = "";
    VDATE_MAX = DATE_CLOTURE;
  } else if (VMOIAN == " Exercice N") {
    VDATE_MIN = PARAM_PDDEX;
    VDATE_MAX = PARAM_PDFEX;
  } else if (VMOIAN == " Exercice N+1") {
    VDATE_MIN = DATE_DEBUT_NOUVEL_E;
    VDATE_MAX = DATE_CLOTURE;
  } else {
    VDATE_MIN = "01/" + VMOIAN.chaine();
    VDATE_MAX = Date::dJour(Date::finMois(Date::jDate(VDATE_MIN.chaine())));
  }
  VDATE_DEBUT = VDATE_MIN;
  VDATE_FIN = VDATE_MAX;
}

void MIRVAEAcces::verifierBorne(Evt* e, Date& date, const char* start, const char* control) {
  if (date < VDATE_MIN || date > VDATE_MAX) {
    refuseInput(e, start + VDATE_MIN + " et le " + VDATE_MAX + " !", control);
    return;
  }
  requery();
}

void MIRVAEAcces::vdate_debut(Evt* e) {
  verifierBorne(e, VDATE_DEBUT, "La date début doit être comprise entre le ", "VDATE_DEBUT");
}

void MIRVAEAcces::vdate_fin(Evt* e) {
  verifierBorne(e, VDATE_FIN, "La date fin doit être comprise entre le ", "VDATE_FIN");
}

// ---------------------------------------------------------------------------- filters

void MIRVAEAcces::vimput(Evt*) { requery(); }

void MIRVAEAcces::vnpiec(Evt*) {
  VNPIEC_TOUS = VNPIEC == "" ? "O" : "";
  ecran()->affiche(pieceGroup(), "");
  requery();
}

void MIRVAEAcces::vnpiec_tous(Evt*) {
  if (VNPIEC_TOUS == "O") VNPIEC = "";
  ecran()->affiche(pieceGroup(), "");
  requery();
}

// ---------------------------------------------------------------------------- list

void MIRVAEAcces::active_requete(Evt* e) {
  Scritere::active_requete(e);
  Table& main = *table(false);
  main.initRequete();
  main.ajouteFiltre(TYPE, '=', kind_.type, 'A');
  if (VDATE_DEBUT) main.ajouteFiltre(DTOPE, '+', VDATE_DEBUT, 'A');
  if (VDATE_FIN) main.ajouteFiltre(DTOPE, '-', VDATE_FIN, 'A');
  filterOnAccounts(main);
  if (VNPIEC) main.ajouteFiltre(NPIEC, '=', VNPIEC, 'A');
  main.choisitIndex("INDX1", 'A');
  main.activeRequete();
  ecran()->affiche("LST", "");
}

void MIRVAEAcces::debut_activation(Evt*) { requery(); }

void MIRVAEAcces::lst_selection(Evt* e) {
  if (PIECE.lit(3, PIECE_NPIES, '=', NPIES) != 0) {
    PIECE.raz();
    // An operation of a past exercise whose piece is gone was posted: the piece
    // went with the closing of that exercise.
    if (DTOPE < PARAM_PDDEX) PIECE_IMPUT = "O";
  }
  if ((VIMPUT == "O" && PIECE_IMPUT != "O") || (VIMPUT == "N" && PIECE_IMPUT == "O")) {
    rejeter(e);
    return;
  }
  describeRow(e);
}

std::string MIRVAEAcces::rowAccountTitle(Table& accounts, Champ& number, Champ& title) {
  if (accounts.lit(3, number, '=', NUMCP) == 0) return title.chaine();
  accounts.raz();
  return kind_.rowUnknownTitle + NUMCP + "> inexistant !";
}

void MIRVAEAcces::lst_liste_vide(Evt*) { ecran()->interdit("GERER", "MODIFIER", "VISU_PIECE", ""); }

void MIRVAEAcces::lst_liste_pleine(Evt*) { ecran()->autorise("GERER", "MODIFIER", "VISU_PIECE", ""); }

// ---------------------------------------------------------------------------- dossier control

void MIRVAEAcces::controler_dossier(Evt* e) {
  int code = 0;
  if (PARAM_PXCLO == "C") {
    code = 1;
    EvtParamRef question(1, libelle("02401") + libelle("024011"));
    appelerProcedure("*", "CPMESSAG", "INTERFACE", "MESS_ON", &question, -1);
    if (erreurMethode() == 1) {
      Chaine moduleName(kind_.accessModule());
      EvtParamRef evt(1, &moduleName);
      appelerModule("", "COMPTA", "LANCE_REOUVERTURE_ANNU", &evt);
      PARAM.lit(3, PARAM_PNUME, '=', Valeur::entier(1));
      if (PARAM_PXCLO == "N") code = 0;
    }
  } else if (PARAM_PXCLO == "O") {
    messageOk(libelle("0240"));
    code = 1;
  }
  erreurMethode(code, e);
}

// ---------------------------------------------------------------------------- actions

void MIRVAEAcces::ouvrirGestion(const char* mode) {
  Chaine V_MODE("V_MODE", "", "", 4, nullptr);
  V_MODE = mode;
  lancerModule("", "MIRVAE", kind_.entryModule().c_str(), new EvtParamVal(2, &IDENT, &V_MODE));
}

void MIRVAEAcces::gerer(Evt*) {
  VIDENT = IDENT;
  ouvrirGestion(PARAM_PXCLO == "C" || PARAM_PXCLO == "O" ? "Vv" : "VMCAv");
}

void MIRVAEAcces::modifier(Evt*) {
  appelerProcedure("", "", "", "CONTROLER_DOSSIER", nullptr, 0);
  if (erreurMethode() != 0) return;
  VIDENT = IDENT;
  ouvrirGestion("VMCAm");
}

void MIRVAEAcces::creer(Evt*) {
  appelerProcedure("", "", "", "CONTROLER_DOSSIER", nullptr, 0);
  if (erreurMethode() != 0) return;
  VIDENT = "";
  ouvrirGestion("VMCAc");
}

void MIRVAEAcces::impr_fiche(Evt*) {
  Chaine V_REQUETE("V_REQUETE", "", "", 4, nullptr);
  V_REQUETE = model::requeteFiche(IDENT.chaine());
  Chaine name(kind_.printForm());
  EvtParamRef evt(2, &name, &V_REQUETE);
  appelerProcedure("*", "MIRVAE", "INTERFACE", "IMPRESSION", &evt, -1);
}

void MIRVAEAcces::impr_liste(Evt*) {
  Chaine V_REQUETE("V_REQUETE", "", "", 4, nullptr);
  V_REQUETE = table(false)->requete();
  Chaine name(kind_.printList());
  EvtParamRef evt(2, &name, &V_REQUETE);
  appelerProcedure("*", "MIRVAE", "INTERFACE", "IMPRESSION", &evt, -1);
}

void MIRVAEAcces::visu_piece(Evt*) {
  if (NPIES == "") {
    BoiteMessage("Opération refusée car la pièce n'a pas été comptabilisée.", 0, nullptr);
    return;
  }
  if (PIECE.lit(3, PIECE_NPIES, '=', NPIES) != 0) {
    BoiteMessage("Opération impossible car la pièce <" + NPIES + "> est inexistante !", 0, nullptr);
    return;
  }
  EvtParamRef evt(1, &NPIES);
  appelerModule("", "COMPTA", "VISUECRI", &evt);
}

}  // namespace browser
