// The lines: account, VAT code and rate, the typed amount and the two computed ones,
// the totals, and the analytic breakdown of a line.
//
// The user types one amount in the column "LST_V_HT": excluding tax when SAISIE_MTT
// is "1", including tax when it is "2". Only the VAT is rounded; the other amount is
// the typed one plus or minus that VAT, so HT + TVA = TTC holds on every line.
#include "entry/parts.h"

#include <array>

#include "registry/analytic_call.h"

namespace entry {

namespace {

bool contient(const Donnee& letters, char letter) { return letters.chaine().find(letter) != std::string::npos; }

}  // namespace

// ---------------------------------------------------------------------------- showing and entering a line

void EntryScreen::selection(Evt* e) {
  Sdocum::selection(e);
  LineAccount& account = line();
  lireOuVider(account.accounts(), account.NUMCP(), MIRVAL_NUMCP);
  account.label() = account.LIBCP();
  lireOuVider(CDTVA, CDTVA_COTVA, MIRVAL_COTVA);
  if (MIRVAE_SAISIE_MTT == "1") {
    V_HT = MIRVAL_HT;
    V_TTC = MIRVAL_TTC;
  } else if (MIRVAE_SAISIE_MTT == "2") {
    V_HT = MIRVAL_TTC;
    V_TTC = MIRVAL_HT;
  }
}

void EntryScreen::ctrl_debut_ligne(Evt* e) {
  Sdocum::ctrl_debut_ligne(e);
  LineAccount& account = line();
  if (lireOuVider(COMPT, COMPT_NUMCP, MIRVAL_NUMCP)) {
    account.label() = COMPT_LIBCP;
    account.number() = COMPT_NUMCP;
  } else {
    account.label() = "";
    account.number() = "";
  }
  if (&account.accounts() != &COMPT) {
    account.accounts().raz();
    account.accounts().copier(COMPT);
  }
  enFile("V_SAISIE_COMPT");
  ANA_O_N = 0;
  if (ANA_GR_ACTIF == 1) {
    EvtParamRef analytique(1, &ANA_O_N);
    procedure("GESTION_ANALY_OUI_NON", &analytique);
    if (ANA_O_N == 0)
      ecran()->interdit("BT_ANALYTIQUE", "");
    else
      ecran()->autorise("BT_ANALYTIQUE", "");
  }
}

void EntryScreen::debut_creation_ligne(Evt* e) {
  Sdocum::debut_creation_ligne(e);
  V_HT = 0;
  V_TTC = 0;
  enFile("V_SAISIE_COMPT");
  ecran()->interdit("BT_ANALYTIQUE", "");
}

void EntryScreen::v_saisie_compt2_ferme(Evt*) { enFile("V_SAISIE_COMPT"); }

void EntryScreen::v_saisie_compt(Evt*) {
  if (V_SAISIE_COMPT == "NUMCP") {
    ecran()->autorise("LST_MIRVAL.NUMCP", "");
    ecran()->interdit(line().labelControl(), "");
  } else if (V_SAISIE_COMPT == "LIBCP") {
    ecran()->autorise(line().labelControl(), "");
    ecran()->interdit("LST_MIRVAL.NUMCP", "");
  }
}

// Whether the account in COMPT takes an analytic breakdown, into parameter 0.
void EntryScreen::gestion_analy_oui_non(Evt* e) {
  int result = 0;
  if (contient(COMPT_NATUC, 'Q')) {
    if (ANA_GR1_ACTIF != 0)
      result = 1;
    else
      result = contient(COMPT_NATUC, 'H') || contient(COMPT_NATUC, 'P') || contient(COMPT_NATUC, 'D') ? 1 : 0;
  }
  e->parametre(0) = result;
}

void EntryScreen::saisie_mtt(Evt*) {
  if (MIRVAE_SAISIE_MTT == "1") {
    V_SAISIE_MTT = "HT";
    ecran()->libelle("LST_V_HT", "Mtt HT");
    ecran()->libelle("LST_V_TTC", "Mtt TTC");
  } else if (MIRVAE_SAISIE_MTT == "2") {
    V_SAISIE_MTT = "TTC";
    ecran()->libelle("LST_V_HT", "Mtt TTC");
    ecran()->libelle("LST_V_TTC", "Mtt HT");
  }
  ecran()->affiche("LST", "");
}

// ---------------------------------------------------------------------------- account of the line

void EntryScreen::lst_mirval_numcp(Evt* e) {
  LineAccount& account = line();
  if (MIRVAL_NUMCP.estVide()) {
    account.number() = "";
    account.label() = "";
    afficherLigne();
    return;
  }
  for (Part* part : parts_)
    if (!part->lineAccountAccepted(e, MIRVAL_NUMCP.chaine())) return;
  EvtParamVal controle(3, "NUMCP", &MIRVAL_NUMCP, lineNature());
  procedure("CONTROLER_COMPT", &controle);
  if (erreurMethode() != 0 || account.accounts().lit(3, account.NUMCP(), '=', MIRVAL_NUMCP) != 0) {
    controler("LST_MIRVAL.NUMCP");
    rejeter(e);
    return;
  }
  completerLigne();
}

void EntryScreen::lineAccountLabel(Evt* e) {
  LineAccount& account = line();
  if (account.label().estVide()) {
    account.number() = "";
    MIRVAL_NUMCP = "";
    afficherLigne();
    return;
  }
  for (Part* part : parts_)
    if (!part->lineAccountAccepted(e, account.label().chaine())) return;
  EvtParamVal controle(3, "LIBCP", &account.label(), lineNature());
  procedure("CONTROLER_COMPT", &controle);
  if (erreurMethode() != 0 || account.accounts().lit(3, account.LIBCP(), '=', account.label()) != 0) {
    controler(account.labelControl());
    rejeter(e);
    return;
  }
  completerLigne();
}

void EntryScreen::completerLigne() {
  LineAccount& account = line();
  account.label() = account.LIBCP();
  account.number() = account.NUMCP();
  MIRVAL_NUMCP = account.NUMCP();
  if (TVA_GR_ACTIF == 0) {
    MIRVAL_COTVA = "";
    MIRVAL_TXTVA = 0;
  } else {
    MIRVAL_COTVA = account.COTVA();
    lireOuVider(CDTVA, CDTVA_COTVA, MIRVAL_COTVA);
    EvtParamRef taux(3, &CDTVA_COTVA, &MIRVAE_DTOPE, &VTXTVA);
    compta("LECTURE_HISTO_TXTVA", &taux);
    // Through the rate's decimal text: 19.6 stays 19.6 in the line's rate.
    MIRVAL_TXTVA = VTXTVA.decimal();
  }
  procedure("CALCUL_MTT_LIGNE");
  MIRVAL_CPOST = account.CPOST();
  MIRVAL_CCRIT = account.CCRIT();
  for (Part* part : parts_) part->lineAccountRead();
  afficherLigne();
}

void EntryScreen::chooseLineAccount(Evt*) {
  if (enVisualisation()) {
    messageOk("Opération interdite en mode visualisation !");
    return;
  }
  EvtParamVal liste(1, "LST");
  procedure("CTRL_DEBUT_MODIF_LISTE", &liste);
  LineAccount& account = line();
  bool parNumero = V_SAISIE_COMPT == "NUMCP";
  Chaine& valeur = parNumero ? account.number() : account.label();
  const char* colonne = parNumero ? "NUMCP" : "LIBCP";
  // The window opens on the kind's pattern of accounts, if it has one.
  Chaine pattern(kind_.lineAccountPattern);
  Donnee* start = *kind_.lineAccountPattern ? static_cast<Donnee*>(&pattern)
                                            : parNumero ? &account.NUMCP() : &account.LIBCP();
  EvtParamRef choix(5, &valeur, start, lineNature(), colonne, "N");
  appelerProcedure("*", "CPCOMPT", "INTERFACE", "CHOIX_INTITULE_REDUIT", &choix, -1);
  EvtParamVal controle(3, colonne, &valeur, lineNature());
  procedure("CONTROLER_COMPT", &controle);
  if (erreurMethode() != 0 || valeur.estVide()) {
    account.number() = "";
    account.label() = "";
    MIRVAL_NUMCP = "";
    afficherLigne();
    return;
  }
  account.label() = COMPT_LIBCP;
  account.number() = COMPT_NUMCP;
  enFile(account.labelControl());
}

void EntryScreen::ctrl_ouvre(Evt* e) {
  std::string control = e->nbParams() > 0 ? e->parametre(0).chaine() : std::string();
  if (control == "LST_MIRVAL.NUMCP" || control == line().labelControl())
    procedure(line().chooseBranch());
  else if (control == "LST_MIRVAL.COTVA")
    procedure("CDTVA_CHOISIR");
  else
    Saisie::ctrl_ouvre(e);
}

void EntryScreen::ctrl_choisir(Evt* e) {
  std::string control = e->nbParams() > 0 ? e->parametre(0).chaine() : std::string();
  for (Part* part : parts_)
    if (part->chooses(control)) return;
  Gestion_document2::ctrl_choisir(e);
}

// ---------------------------------------------------------------------------- VAT code of the line

void EntryScreen::lst_mirval_cotva(Evt* e) {
  if (MIRVAL_COTVA.estVide()) {
    MIRVAL_TXTVA = 0;
    procedure("CALCUL_MTT_LIGNE");
    afficherLigne();
    return;
  }
  if (CDTVA.lit(3, CDTVA_COTVA, '=', MIRVAL_COTVA) != 0) {
    messageOk("Le code TVA est inexistant !");
    controler("LST_MIRVAL.COTVA");
    rejeter(e);
    return;
  }
  EvtParamRef taux(3, &CDTVA_COTVA, &MIRVAE_DTOPE, &VTXTVA);
  compta("LECTURE_HISTO_TXTVA", &taux);
  MIRVAL_COTVA = CDTVA_COTVA;
  MIRVAL_TXTVA = VTXTVA.decimal();
  procedure("CALCUL_MTT_LIGNE");
  afficherLigne();
}

void EntryScreen::cdtva_choisir(Evt*) {
  if (enVisualisation()) {
    messageOk("Opération interdite en mode visualisation !");
    return;
  }
  Chaine PERREUR("PERREUR", "", "", 4, this);
  EvtParamRef choix(3, &MIRVAL_COTVA, &PERREUR, vatChoiceType());
  appelerProcedure("*1", "CPCDTVA", "INTERFACE", "CHOIX", &choix, -1);
  EvtParamVal liste(1, "LST");
  procedure("CTRL_DEBUT_MODIF_LISTE", &liste);
  if (PERREUR == "2") MIRVAL_COTVA = "";
  enFile("LST_MIRVAL.COTVA");
}

// ---------------------------------------------------------------------------- amounts

void EntryScreen::lst_v_ht(Evt*) {
  procedure("CALCUL_MTT_LIGNE");
  afficherLigne();
}

// The VAT typed over the computed one is kept; only the other amount follows.
void EntryScreen::lst_mirval_tva(Evt*) {
  if (MIRVAE_SAISIE_MTT == "1")
    procedure("CALCUL_TTC");
  else if (MIRVAE_SAISIE_MTT == "2")
    procedure("CALCUL_HT");
  afficherLigne();
}

void EntryScreen::calcul_mtt_ligne(Evt*) {
  if (MIRVAE_SAISIE_MTT == "1") {
    MIRVAL_HT = V_HT;
    procedure("CALCUL_TVA_SELON_HT");
    procedure("CALCUL_TTC");
  } else if (MIRVAE_SAISIE_MTT == "2") {
    MIRVAL_TTC = V_HT;
    procedure("CALCUL_TVA_SELON_TTC");
    procedure("CALCUL_HT");
  }
}

void EntryScreen::calcul_tva_selon_ht(Evt*) {
  if (MIRVAL_TXTVA == 0) {
    MIRVAL_TVA = 0;
    return;
  }
  MIRVAL_TVA = arrondiTva(MIRVAL_HT.decimal() * MIRVAL_TXTVA.decimal() / Decimal(100));
}

void EntryScreen::calcul_tva_selon_ttc(Evt*) {
  if (MIRVAL_TXTVA == 0) {
    MIRVAL_TVA = 0;
    return;
  }
  // TTC × (1 − 1 / (1 + t / 100)) is TTC × t / (100 + t): one division, made last,
  // so that an exact result is not cut before it is rounded.
  Decimal rate = MIRVAL_TXTVA.decimal();
  MIRVAL_TVA = arrondiTva(MIRVAL_TTC.decimal() * rate / (Decimal(100) + rate));
}

void EntryScreen::calcul_ttc(Evt*) {
  MIRVAL_TTC = MIRVAL_HT.decimal() + MIRVAL_TVA.decimal();
  V_TTC = MIRVAL_TTC;
}

void EntryScreen::calcul_ht(Evt*) {
  MIRVAL_HT = MIRVAL_TTC.decimal() - MIRVAL_TVA.decimal();
  V_TTC = MIRVAL_HT;
}

// ---------------------------------------------------------------------------- line validation and totals

void EntryScreen::validation_ligne(Evt* e) {
  if (MIRVAL_NUMCP.estVide()) return refuser(e, kind_.lineAccountRequired, line().labelControl());
  if (V_HT == 0)
    return refuser(e, "La saisie d'un montant " + V_SAISIE_MTT.chaine() + " est obligatoire !", "LST_V_HT");
  if (!(MIRVAL_TVA == 0) && MIRVAL_COTVA.estVide())
    return refuser(e, "La saisie d'un code TVA est obligatoire !", "LST_MIRVAL.COTVA");
  if (MIRVAL_IDENT.estVide()) nouvelIdentifiant("MIRVAL", MIRVAL_IDENT);
  Sdocum::validation_ligne(e);
}

void EntryScreen::apres_validation_ligne(Evt* e) {
  Sdocum::apres_validation_ligne(e);
  procedure("CALCUL_TOTAUX");
  EvtParamVal appelant(1, "VALIDATION_LIGNE");
  procedure("APPEL_ANALYTIQUE", &appelant);
}

void EntryScreen::apres_suppression_ligne(Evt* e) {
  Sdocum::apres_suppression_ligne(e);
  procedure("CALCUL_TOTAUX");
}

void EntryScreen::maj_lignes_memoire(Evt*) {
  MEM_MIRVAL.initRequete();
  MEM_MIRVAL.activeRequete();
  for (int rc = MEM_MIRVAL.suivant(3); rc == 0; rc = MEM_MIRVAL.suivant(1)) {
    MEM_MIRVAL_TTC = MEM_MIRVAL_HT.decimal() + MEM_MIRVAL_TVA.decimal();
    MEM_MIRVAL.ecrit();
  }
  procedure("CALCUL_TOTAUX");
}

void EntryScreen::forEachLine(const std::function<void(Table& line)>& add) {
  bool lines = false;
  MEM_MIRVAL.initRequete();
  MEM_MIRVAL.activeRequete();
  for (int rc = MEM_MIRVAL.suivant(3); rc == 0; rc = MEM_MIRVAL.suivant(1)) {
    lines = true;
    add(MEM_MIRVAL);
  }
  if (lines) return;
  // The bar keeps a header without identifier from selecting every operation's lines.
  MIRVAL2.initRequete();
  MIRVAL2.ajouteFiltre(MIRVAL2_NUMERO, '/', MIRVAE_IDENT.chaine() + "|");
  MIRVAL2.activeRequete();
  for (int rc = MIRVAL2.suivant(3); rc == 0; rc = MIRVAL2.suivant(1)) add(MIRVAL2);
}

// ---------------------------------------------------------------------------- analytic breakdown

void EntryScreen::bt_analytique(Evt*) {
  EvtParamVal appelant(1, "BT_ANALYTIQUE");
  procedure("APPEL_ANALYTIQUE", &appelant);
}

void EntryScreen::appel_analytique(Evt*) {
  if (ANA_O_N == 0) return;
  bool visualisation = enVisualisation();
  // The launch mode is read once, at construction: PMODE now carries the analytic
  // screen's mode.
  PMODE = visualisation ? "Vv" : "VMm";

  Monnaie V_MTDEB("V_MTDEB", "", "", 4, this), V_MTCRE("V_MTCRE", "", "", 4, this);
  Entier V_SIGNE("V_SIGNE", "", "", 4, this);
  // The rows stand on the side of the line's movement: a negative amount, on the other.
  bool negative = MIRVAL_HT < 0;
  Decimal amount = negative ? -MIRVAL_HT.decimal() : MIRVAL_HT.decimal();
  bool debit = lineOnDebit() != negative;
  V_MTDEB = debit ? amount : Decimal();
  V_MTCRE = debit ? Decimal() : amount;
  V_SIGNE = negative ? -1 : 1;

  MIRVAL_M01.initRequete();
  MIRVAL_M01.vide();
  MIRVAL_M01.raz();
  MIRVAL_M01.copier(MIRVAL);
  MIRVAL_M01.ecrit();

  if (visualisation) procedure("EXTRACTION_TABLE_MIRVAANA");

  namespace analytic = registry::analytic;
  std::array<Donnee*, analytic::kCount> params{};
  params[analytic::PIDENT] = &MIRVAL_IDENT;
  params[analytic::PMODE] = &PMODE;
  params[analytic::P_DTOPE] = &MIRVAE_DTOPE;
  params[analytic::P_COURS] = &MIRVAE_COURS;
  params[analytic::P_CPOST] = &MIRVAL_CPOST;
  params[analytic::P_CCRIT] = &MIRVAL_CCRIT;
  params[analytic::P_CSECT] = &COMPT_CSECT;
  params[analytic::P_MTDEBS] = &V_MTDEB;
  params[analytic::P_MTCRES] = &V_MTCRE;
  params[analytic::P_SIGNE] = &V_SIGNE;
  params[analytic::P_SAISIE_OBLIGATOIRE] = &COMPT_SAANA;
  Evt analytique;
  for (Donnee* param : params) analytique.ajouterReference(*param);
  appelerModule("", "MIRVAE", "GEST_ANA", &analytique);
  // The line itself is kept by the document; showing it again is all it needs.
  if (!visualisation) afficherLigne();
}

}  // namespace entry
