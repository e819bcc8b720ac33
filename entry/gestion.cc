#include "entry/gestion.h"

#include <vector>

#include "host/currency.h"
#include "host/error.h"
#include "host/session.h"
#include "host/text.h"
#include "model/child_rows.h"
#include "model/interface.h"

namespace entry {

namespace {

constexpr const char* kCrLf = "\r\n";
using host::text::kPiecePlaceholder;

}  // namespace

EntryScreen::EntryScreen(Evt* e, const registry::OperationKind& kind) : Gestion_document2(e), kind_(kind) {
  Evt* launch = lancement();
  if (launch->nbParams() > 0) {
    launch->param(0, PIDENT, 0);
    launch->param(1, PMODE, 0);
  }
  nomBase("CP");
  nomLibelles("LIBE1", "LIBEL");
  nomEcran(kind_.entryScreen().c_str());
  modeSaisie(PMODE);
  nomTable("MIRVAE", nullptr);
  planTri("($TRI$", "INDX1");
  configureDocument("P1,GRP1,LST", "LST", "MIRVAL");
}

// ---------------------------------------------------------------------------- helpers

void EntryScreen::procedure(const char* name, Evt* e) { appelerProcedure("", "", "", name, e, 0); }

void EntryScreen::enFile(const char* name) { lancerProcedure("", "", "", name, nullptr, 0); }

void EntryScreen::compta(const char* name, Evt* e) {
  appelerProcedure("COMPTA", "COMPTA", "MOD_CAL_BIBLIOPROC", name, e, -1);
}

void EntryScreen::messageOk(const std::string& text) {
  EvtParamVal message(1, text);
  appelerProcedure("*", "CPMESSAG", "INTERFACE", "MESS_OK", &message, -1);
}

bool EntryScreen::question(const std::string& text) {
  EvtParamVal message(1, text);
  appelerProcedure("*", "CPMESSAG", "INTERFACE", "MESS_ON", &message, -1);
  return erreurMethode() == 1;
}

void EntryScreen::refuser(Evt* e, const std::string& message, const char* control) {
  messageOk(message);
  controler(control);
  rejeter(e);
  // Showing the message went through another library, whose result replaced ours.
  erreurMethode(1, e);
}

bool EntryScreen::lireOuVider(Table& t, Champ& field, const Donnee& value) {
  if (t.lit(3, field, '=', value) == 0) return true;
  t.raz();
  return false;
}

bool EntryScreen::lireJournal() { return lireOuVider(JONAL, JONAL_NUMJL, MIRVAE_NUMJL); }

// Opening an operation moved JONAL to its journal: a new operation never inherits it.
void EntryScreen::readCreationJournal() {
  switch (kind_.journal) {
    case registry::CreationJournal::FirstOfNature:
      if (JONAL.suivant(3) != 0) JONAL.raz();
      return;
    case registry::CreationJournal::OfFirstTreasury: {
      // The header accounts' selection holds the kind's treasury accounts.
      Champ cptre("CPTRE", &JONAL);
      if (COMPT1.suivant(3) != 0 || JONAL.lit(3, cptre, '=', COMPT1_NUMCP) != 0) JONAL.raz();
      return;
    }
  }
}

std::string EntryScreen::anneeMois() { return host::yearMonth(MIRVAE_DTOPE.jour()); }

void EntryScreen::remplacerPieceDansLibelle() {
  EvtParamRef remplacer(3, &MIRVAE_INPIE, kPiecePlaceholder, &MIRVAE_NPIEC);
  appelerProcedure("*", "SYSASCII", "INTERFACE", "REMPLACER", &remplacer, -1);
}

std::string EntryScreen::prefixe(const Donnee& pattern, const std::string& yearMonth) {
  Chaine V_MOANO("V_MOANO", "", "", 4, this);
  Chaine V_PREFIXE_PIECE("V_PREFIXE_PIECE", "", "", 4, this);
  V_MOANO = yearMonth;
  Chaine motif(pattern.chaine());
  EvtParamRef params(3, &motif, &V_MOANO, &V_PREFIXE_PIECE);
  compta("PREFIXE_NUMERO_PIECE", &params);
  return V_PREFIXE_PIECE.chaine();
}

Decimal EntryScreen::arrondiTva(const Decimal& amount) {
  return Monnaie::valeurArrondie(amount, euro().decimales(MIRVAE_MONNAIE_IDENT.chaine()), "=");
}

void EntryScreen::nouvelIdentifiant(const char* table, Donnee& ident) {
  Entier largeur(8);
  EvtParamRef params(6, "CP", "NDOC", table, "", &largeur, &ident);
  appelerProcedure("*", "ZEFNDOC", "INTERFACE", "ATTRIBUE_NUMERO", &params, -1);
  appelerProcedure("*", "ZEFNDOC", "INTERFACE", "VALIDE_NUMERO", &params, -1);
}

// ---------------------------------------------------------------------------- start

void EntryScreen::init(Evt* e) {
  EvtParamVal liste(1, code() + "-" + "LST");
  appelerModule("ZEFMDS", "$$", "NETTOYAGE_PARAMLST1_LISTE", &liste);
  Gestion_document::init(e);
}

void EntryScreen::avant_debut(Evt* e) {
  Entier FLAG_VERIF_DOS("FLAG_VERIF_DOS", "Les paramètres du dossier sont-ils corrects ? 0/1", "", 4, this);
  EvtParamRef verification(1, &FLAG_VERIF_DOS);
  compta("VERIF_DOSSIER", &verification);
  if (FLAG_VERIF_DOS == 0) {
    Message::nettoie(this);
    sortir(nullptr, 0);
    return;
  }
  montrer("IMPRIME");
  Gestion_document2::avant_debut(e);
}

void EntryScreen::debut(Evt* e) {
  Automate::debut(e);
  if (PARAM.lit(3, PARAM_PNUME, '=', Valeur::entier(1)) != 0) {
    messageOk(libelle("0028"));
    Message::nettoie(this);
    sortir(e, 0);
    return;
  }
  EvtParamRef devise(1, &PARAM_MONNAIE_IDENT);
  appelerProcedure("*1", "MONNAIE", "INTERFACE", "LECTURE", &devise, -1);
  DATE_CLOTURE = PARAM_PDTCL;
  EvtParamRef nouvelExercice(2, &PARAM_PDFEX, &DATE_DEBUT_NOUVEL_E);
  compta("CALCUL_DATE_NOUVEL_EX", &nouvelExercice);
  EvtParamRef options(14, &TVA_GR_ACTIF, &TVA_GR1_ACTIF, &QTE_GR_ACTIF, &QTE1_GR_ACTIF, &QTE2_GR_ACTIF,
                      &ANA_GR_ACTIF, &ANA_GR1_ACTIF, &ANA_GR2_ACTIF, &ECHCLI_GR_ACTIF, &ECHFOU_GR_ACTIF,
                      &ECHAUT_GR_ACTIF, &ECH_GR_ACTIF, &DEVISE_GR_ACTIF, &REGT_GR_ACTIF);
  compta("OPTIONS_DOSSIER", &options);

  if (TVA_GR_ACTIF == 0)
    ecran()->interdit("LST_MIRVAL.COTVA", "LST_MIRVAL.TVA", "CDTVA_CHOISIR", "");
  else
    ecran()->autorise("LST_MIRVAL.COTVA", "LST_MIRVAL.TVA", "CDTVA_CHOISIR", "");
  if (ANA_GR_ACTIF == 0)
    cacher("BT_ANALYTIQUE", "");
  else
    montrer("BT_ANALYTIQUE", "");

  JONAL.initRequete();
  JONAL.ajouteFiltre(JONAL_TYPJL, '=', kind_.journalNature);
  JONAL.choisitIndex("NUMJL");
  JONAL.activeRequete();
  if (JONAL.suivant(3) != 0) {
    JONAL.raz();
    messageOk(kind_.noJournal);
  }

  COMPT1.initRequete();
  COMPT1.ajouteFiltre(COMPT1_NATUC, '?', kind_.headerNature);
  COMPT1.ajouteFiltre(COMPT1_CCTRA, '#', "O");
  COMPT1.choisitIndex("LIBCP");
  COMPT1.activeRequete();

  COMPT2.initRequete();
  COMPT2.ajouteFiltre(COMPT2_NATUC, '?', kind_.lineNature);
  COMPT2.ajouteFiltre(COMPT2_CCTRA, '#', "O");
  COMPT2.choisitIndex("NUMCP");
  COMPT2.activeRequete();

  CDTVA.initRequete();
  if (kind_.vatCodeFilter) CDTVA.ajouteFiltre(CDTVA_TYTVA, kind_.vatCodeFilter, kind_.vatCodeType);
  CDTVA.choisitIndex("COTVA");
  CDTVA.activeRequete();

  ecran()->commande(1, "Infos fiche");
}

void EntryScreen::selection_tri(Evt* e) {
  if (MIRVAE_TYPE != kind_.type) rejeter(e);
  Automate::selection_tri(e);
}

// ---------------------------------------------------------------------------- list columns

void EntryScreen::ctrl_defaut_colonne(Evt* e) {
  Automate::ctrl_defaut_colonne(e);
  procedure("SAISIE_MTT");
}

void EntryScreen::ctrl_custom_colonne(Evt*) { BoiteMessage("Cette liste n'est pas personnalisable.", 0, nullptr); }

void EntryScreen::ctrl_cache_colonne(Evt*) { BoiteMessage("Cette liste n'est pas personnalisable.", 0, nullptr); }

// ---------------------------------------------------------------------------- record information, print

void EntryScreen::commande1(Evt*) { procedure("INFO_FICHE"); }

void EntryScreen::info_fiche(Evt*) {
  procedure("CONSTITUER_INFO_FICHE");
  procedure("COMPLETER_INFO_FICHE");
  EvtParamRef texte(1, &V_INFO_FICHE);
  appelerProcedure("*", "CPPARAM", "INTERFACE", "INFO_FICHE", &texte, -1);
}

void EntryScreen::constituer_info_fiche(Evt*) {
  V_INFO_FICHE = "Composant : " + nomSource() + " - N° interne : " + MIRVAE_IDENT.chaine() + kCrLf + kCrLf +
                 "Date de création : " + MIRVAE_DATEC.chaine() + " - Heure : " + MIRVAE_HEUREC.chaine() + kCrLf +
                 "Date de modification : " + MIRVAE_DATEM.chaine() + " - Heure : " + MIRVAE_HEUREM.chaine() +
                 kCrLf + kCrLf + "Utilisateur : " + MIRVAE_USERM.chaine() + kCrLf;
}

// A hook: the screens that show more about a record add it here.
void EntryScreen::completer_info_fiche(Evt*) {}

void EntryScreen::imprime(Evt*) { procedure("IMPR_FICHE"); }

void EntryScreen::impr_fiche(Evt*) {
  Chaine V_REQUETE("V_REQUETE", "", "", 4, this);
  V_REQUETE = model::requeteFiche(MIRVAE_IDENT.chaine());
  EvtParamVal impression(2, kind_.printForm(), &V_REQUETE);
  appelerProcedure("*", "MIRVAE", "INTERFACE", "IMPRESSION", &impression, -1);
}

// ---------------------------------------------------------------------------- modes

void EntryScreen::modification(Evt* e) {
  if (!MIRVAE_DTOPE.estVide() && MIRVAE_DTOPE < PARAM_PDDEX) {
    messageOk("La date d'opération est antérieure à la date de début d'exercice.@La modification est impossible !");
    ecran()->toVisu();
    return;
  }
  Entier V_FLAG_E("V_FLAG_E", "", "", 4, this);
  EvtParamRef verification(2, &V_FLAG_E, &MIRVAE_NPIES);
  appelerModule("", "MIRVAE", "VERIFIER_MODIF_PIECE", &verification);
  if (V_FLAG_E == 1) {
    ecran()->toVisu();
    return;
  }
  Setape::modification(e);
}

void EntryScreen::creat2(Evt* e) {
  IDENT_ORIGINE = MIRVAE_IDENT;
  MONNAIE_ORIGINE = MIRVAE_MONNAIE_IDENT;
  COURS_ORIGINE = MIRVAE_COURS;
  lireJournal();
  MIRVAE_NPIEC = JONAL_NUMEROPI == "A" ? kPiecePlaceholder : "";
  if (JONAL_PREFIXIN.estVide()) MIRVAE_INPIE = kind_.defaultLabel;
  // The copy has no ledger piece of its own.
  MIRVAE_NPIES = "";
  Gestion_document2::creation2(e);
}

void EntryScreen::debut_visualisation(Evt* e) { Saisie::debut_visualisation(e); }

void EntryScreen::debut_modification(Evt* e) {
  Saisie::debut_modification(e);
  V_CMODEL = "";
  // A saved operation keeps its journal: its piece was numbered there.
  ecran()->interdit("V_CMODEL", "MODTE_CHOISIR", "NUMJL", "");
}

void EntryScreen::debut_creation(Evt* e) {
  Saisie::debut_creation(e);
  MIRVAE_TYPE = kind_.type;
  readCreationJournal();
  MIRVAE_NUMJL = JONAL_NUMJL;

  MIRVAE_DTOPE = Date::dateCourante();
  // A day the ledger would refuse is not proposed: the user types the date.
  if (MIRVAE_DTOPE > DATE_CLOTURE || MIRVAE_DTOPE < PARAM_PDDEX) MIRVAE_DTOPE = "";
  if (JONAL_NUMEROPI == "A") MIRVAE_NPIEC = kPiecePlaceholder;

  if (kind_.currency == registry::CreationCurrency::Dossier)
    MIRVAE_MONNAIE_IDENT = PARAM_MONNAIE_IDENT;
  else
    MIRVAE_MONNAIE_IDENT = JONAL.valeur("MONNAIE_IDENT");
  EvtParamRef devise(1, &MIRVAE_MONNAIE_IDENT);
  appelerProcedure("*1", "MONNAIE", "INTERFACE", "LECTURE", &devise, -1);

  if (JONAL_PREFIXIN.estVide()) MIRVAE_INPIE = kind_.defaultLabel;
  switch (kind_.dueDate) {
    case registry::CreationDueDate::OperationDate: MIRVAE_DTECH = MIRVAE_DTOPE; break;
    case registry::CreationDueDate::Today: MIRVAE_DTECH = Date::dateCourante(); break;
    case registry::CreationDueDate::None: break;
  }
  MIRVAE_COURS = euro().cours(MIRVAE_MONNAIE_IDENT.chaine(), MIRVAE_DTOPE.jour());

  if (kind_.models) ecran()->autorise("V_CMODEL", "MODTE_CHOISIR", "");
  MIRVAE_SAISIE_MTT = kind_.amountTyped;
  procedure("SAISIE_MTT");
}

void EntryScreen::apres_debut_creation(Evt* e) {
  Sdocum::apres_debut_creation(e);
  if (!IDENT_ORIGINE.estVide()) procedure("IMPORTATION_LIGNES");
  if (!V_CMODEL.estVide()) procedure("MODTE_GENERER");
}

void EntryScreen::fin_creation(Evt* e) {
  Saisie::fin_creation(e);
  // The copy is saved: the creation that follows is a new piece, not the same
  // operation duplicated once more.
  IDENT_ORIGINE = "";
  MONNAIE_ORIGINE = "";
  COURS_ORIGINE = 0;
  if (V_CREAT_ACTIF == 1) {
    V_CREAT_ACTIF = 0;
    enFile("CREATION");
  } else {
    V_CMODEL = "";
  }
}

void EntryScreen::dialogue(Evt* e) {
  if (e->nbParams() >= 2 && e->parametre(0) == "VA_CREAT") {
    // The screen always goes on creating after a creation was saved.
    e->parametre(1) = 1;
    return;
  }
  Sdocum::dialogue(e);
}

// ---------------------------------------------------------------------------- opening a record

void EntryScreen::debut_fiche(Evt* e) {
  Gestion_document2::debut_fiche(e);
  if (!lireOuVider(COMPT1, COMPT1_NUMCP, MIRVAE_NUMCP))
    VLIBCP1 = enCreation() ? std::string() : kind_.headerUnknownOpen + MIRVAE_NUMCP.chaine() + "> inexistant !";
  else
    VLIBCP1 = COMPT1_LIBCP;
  lireJournal();
  procedure("SAISIE_MTT");
  lireOuVider(PIECE, PIECE_NPIES, MIRVAE_NPIES);
  switchCurrency("DB");
  procedure("CALCUL_TOTAUX");
}

// ---------------------------------------------------------------------------- validation and saving

void EntryScreen::b_valid_doc(Evt*) { enFile("VALID_DOC"); }

void EntryScreen::valid_doc(Evt* e) {
  if (enVisualisation()) return;
  Setape::valid_doc(e);
}

void EntryScreen::b_aband_doc(Evt* e) {
  if (enVisualisation()) {
    sortir(e, 0);
    return;
  }
  enFile("ABAND_DOC");
}

void EntryScreen::validation(Evt* e) {
  if (enCreation()) {
    std::vector<std::string> choices;
    for (const char* choice : kind_.choices)
      if (choice) choices.emplace_back(choice);
    V_CHOIX = BoiteDialogue("Attention", "Que désirez-vous faire ?", 2, choices);
    if (V_CHOIX == "1") {
      V_CREAT_ACTIF = 0;
      V_IMPR_FICHE = 0;
      V_CMODEL = "";
    } else if (V_CHOIX == "2") {
      V_CREAT_ACTIF = 1;
      V_IMPR_FICHE = 0;
    } else if (V_CHOIX == "3") {
      V_CMODEL = "";
      V_CREAT_ACTIF = 0;
      V_IMPR_FICHE = 1;
    } else {
      controler("");
      rejeter(e);
      return;
    }
  }
  // Each check shows its message and puts the focus on the faulty control itself.
  for (const char* check : {"CONTROLER_P1", "CONTROLER_GRP1", "CONTROLER_LST"}) {
    procedure(check);
    if (erreurMethode() != 0) {
      rejeter(e);
      return;
    }
  }
  MIRVAE_HT = V_TOT_HT;
  MIRVAE_TVA = V_TOT_TVA;
  MIRVAE_TTC = V_TOT_TTC;
  if (enCreation()) {
    MIRVAE_DATEC = Date::dateCourante();
    MIRVAE_HEUREC = Date::heureCourante();
  } else {
    MIRVAE_DATEM = Date::dateCourante();
    MIRVAE_HEUREM = Date::heureCourante();
  }
  MIRVAE_USERM = Univers::utilisateur();
  Saisie::validation(e);
}

void EntryScreen::apres_validation(Evt* e) {
  Sdocum::apres_validation(e);
  // The piece the operation had: the save replaces it within this same user action.
  bool remplace = !MIRVAE_NPIES.estVide() && lireOuVider(PIECE, PIECE_NPIES, MIRVAE_NPIES);
  EvtParamVal suppression(2, &MIRVAE_NPIES, "N");
  appelerModule("", "MIRVAE", "SUPPRIMER_PIECE", &suppression);
  // A piece the ledger would not let go (matched, settled, or held by another user
  // since the modification began) must not be posted a second time beside it.
  if (remplace && lireOuVider(PIECE, PIECE_NPIES, MIRVAE_NPIES))
    throw HostError("La pièce comptable " + MIRVAE_NPIES.chaine() +
                    " n'a pas pu être supprimée : la modification n'est pas enregistrée.");
  Chaine VIDENT("VIDENT", "", "", 4, this);
  VIDENT = MIRVAE_IDENT;
  EvtParamVal comptabilisation(1, &MIRVAE_IDENT);
  appelerModule("", "MIRVAE", kind_.postingModule().c_str(), &comptabilisation);
  // The posting wrote the new piece number into the header.
  if (table(false)->lit(3, MIRVAE_IDENT, '=', VIDENT) != 0)
    throw HostError("l'opération « " + VIDENT.chaine() + " » a disparu pendant sa comptabilisation");
  bool comptabilisee = !MIRVAE_NPIES.estVide() && lireOuVider(PIECE, PIECE_NPIES, MIRVAE_NPIES);
  // A modification whose new piece the ledger refused would leave the operation with
  // no piece at all: the whole save is undone instead, the old piece with it.
  if (remplace && !comptabilisee)
    throw HostError(
        "La nouvelle pièce n'a pas pu être comptabilisée : la modification n'est pas enregistrée, "
        "l'ancienne pièce est conservée.");
  ecran()->affiche("P1", "GRP1", "LST", "GRP_TOT", "");
  if (V_IMPR_FICHE == 1) procedure("IMPR_FICHE");
  V_IMPR_FICHE = 0;
}

void EntryScreen::avant_suppression(Evt* e) {
  if (PIECE_IMPUT == "O") {
    messageOk("Cette pièce est validée définitivement.@La suppression est impossible !");
    return;
  }
  EvtParamVal suppression(2, &MIRVAE_NPIES, "N");
  appelerModule("", "MIRVAE", "SUPPRIMER_PIECE", &suppression);
  // The operation goes only with its piece: one the ledger keeps (matched, settled,
  // or held by another user) would stay in the books without its operation.
  if (!MIRVAE_NPIES.estVide() && lireOuVider(PIECE, PIECE_NPIES, MIRVAE_NPIES)) {
    messageOk("La pièce comptable " + MIRVAE_NPIES.chaine() +
              " n'a pas pu être supprimée de la comptabilité.@La suppression est impossible !");
    return;
  }
  Saisie::avant_suppression(e);
}

// ---------------------------------------------------------------------------- data steps of the save

void EntryScreen::extraction_donnees(Evt* e) {
  Sdocum::extraction_donnees(e);
  procedure("EXTRACTION_TABLE_MIRVAANA");
}

void EntryScreen::validation_donnees(Evt* e) {
  procedure("VALIDATION_TABLE_MIRVAANA");
  Sdocum::validation_donnees(e);
}

void EntryScreen::suppression_donnees(Evt* e) {
  procedure("SUPPRESSION_TABLE_MIRVAANA");
  Sdocum::suppression_donnees(e);
}

void EntryScreen::extraction_table_mirvaana(Evt*) {
  model::removeChildRows(MIRVAANA_M01, MIRVAANA_M01_NUMERO, MIRVAL_IDENT.chaine());
  model::copyChildRows(MIRVAANA, MIRVAANA_NUMERO, MIRVAANA_M01, MIRVAL_IDENT.chaine());
}

void EntryScreen::validation_table_mirvaana(Evt*) {
  model::copyChildRows(MIRVAANA_M01, MIRVAANA_M01_NUMERO, MIRVAANA, MIRVAL_IDENT.chaine());
}

void EntryScreen::suppression_table_mirvaana(Evt*) {
  model::removeChildRows(MIRVAANA, MIRVAANA_NUMERO, MIRVAL_IDENT.chaine());
}

}  // namespace entry
