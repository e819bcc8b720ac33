#include "entry/parts.h"

#include <algorithm>
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

// ---------------------------------------------------------------------------- composition

// The branches of the client invoice screen, in registration order. The other kinds
// take theirs from it: those of the parts they lack left out, their own added.
const std::vector<std::string_view> kInvoiceBranches = {
    "INIT", "CTRL_DEFAUT_COLONNE", "CTRL_CUSTOM_COLONNE", "CTRL_CACHE_COLONNE ", "AVANT_DEBUT", "DEBUT",
    "SELECTION_TRI", "COMMANDE1", "INFO_FICHE", "CONSTITUER_INFO_FICHE", "COMPLETER_INFO_FICHE", "IMPRIME",
    "IMPR_FICHE", "MODIFICATION", "CREAT2", "DEBUT_VISUALISATION", "DEBUT_MODIFICATION", "DEBUT_CREATION",
    "APRES_DEBUT_CREATION", "FIN_CREATION", "IMPORTATION_LIGNES", "DEBUT_FICHE", "V_CMODEL",
    "V_CMODEL_CHOISIR", "MODTE_CHOISIR", "MODTE_GENERER", "DTOPE", "VLIBCP1", "COMPT1_CHOISIR",
    "CONTROLER_COMPT", "NPIEC_ENTREE", "NPIEC", "PREFIXE_NUMERO_PIECE", "INPIE_ENTREE",
    "PREFIXE_INTITULE_PIECE", "P1_SORTIE", "GRP1_SORTIE", "CONTROLER_P1", "CONTROLER_GRP1", "SELECTION",
    "CTRL_DEBUT_LIGNE", "DEBUT_CREATION_LIGNE", "GESTION_ANALY_OUI_NON", "LST_ENTREE",
    "INCREMENTE_NUMERO_PIECE", "V_SAISIE_COMPT2_FERME", "V_SAISIE_COMPT", "SAISIE_MTT", "LST_MIRVAL.NUMCP",
    "LST_VLIBCP2", "COMPT2_CHOISIR", "LST_V_HT", "LST_MIRVAL.COTVA", "CDTVA_CHOISIR", "LST_MIRVAL.TVA",
    "CALCUL_MTT_LIGNE", "CALCUL_TVA_SELON_HT", "CALCUL_TVA_SELON_TTC", "CALCUL_TTC", "CALCUL_HT",
    "B_VALID_DOC", "VALID_DOC", "VALIDATION", "CONTROLER_LST", "APRES_VALIDATION", "AVANT_SUPPRESSION",
    "B_ABAND_DOC", "VALIDATION_LIGNE", "APRES_VALIDATION_LIGNE", "APRES_SUPPRESSION_LIGNE", "BT_ANALYTIQUE",
    "APPEL_ANALYTIQUE", "CALCUL_TOTAUX", "EXTRACTION_DONNEES", "EXTRACTION_TABLE_MIRVAANA",
    "SUPPRESSION_DONNEES", "SUPPRESSION_TABLE_MIRVAANA", "VALIDATION_DONNEES", "VALIDATION_TABLE_MIRVAANA",
    "CTRL_CHOISIR", "CTRL_OUVRE", "DIALOGUE", "MONNAIE_CHOISIR", "MONNAIE_IDENT", "COURS", "CTRL_BASCULER",
    "CTRL_ACTUALISER_MODE", "CTRL_ACTUALISER_BASCULE", "ACTUALISER_INFO_MONETAIRES", "DEFINIR_BASCULE",
    "MAJ_LIGNES_MEMOIRE",
};


std::vector<std::string_view> branchesWithout(std::vector<std::string_view> order,
                                              std::span<const std::string_view> left,
                                              std::initializer_list<std::string_view> added) {
  std::erase_if(order, [&](std::string_view name) { return std::find(left.begin(), left.end(), name) != left.end(); });
  order.insert(order.end(), added.begin(), added.end());
  return order;
}

void Handlers::add(std::string_view name, Automate::Handler handler) {
  if (!handlers_.emplace(std::string(name), std::move(handler)).second)
    throw HostError("la branche « " + std::string(name) + " » a deux traitements");
}

Automate::Handler Handlers::take(std::string_view name) {
  auto found = handlers_.find(name);
  if (found == handlers_.end()) return {};
  Automate::Handler handler = std::move(found->second);
  handlers_.erase(found);
  return handler;
}

Part::Part(EntryScreen& screen) : s_(screen) { screen.parts_.push_back(this); }

LineAccount& EntryScreen::line() {
  if (!line_) throw HostError("l'écran « " + code() + " » n'a pas de compte de ligne");
  return *line_;
}

void EntryScreen::registerBranches(const std::vector<std::string_view>& order) {
  Handlers handlers;
  provide(handlers);
  for (Part* part : parts_) part->provide(handlers);
  for (std::string_view name : order) {
    Automate::Handler handler = handlers.take(name);
    if (!handler) throw HostError("la branche « " + std::string(name) + " » n'a pas de traitement, ou figure deux fois");
    addBranch(std::string(name), std::move(handler));
  }
  if (!handlers.left().empty())
    throw HostError("le traitement « " + handlers.left().begin()->first + " » n'est pas dans la table des branches");
}

void EntryScreen::provide(Handlers& handlers) {
  handlers.add("INIT", this, &EntryScreen::init);
  handlers.add("CTRL_DEFAUT_COLONNE", this, &EntryScreen::ctrl_defaut_colonne);
  handlers.add("CTRL_CUSTOM_COLONNE", this, &EntryScreen::ctrl_custom_colonne);
  handlers.add("CTRL_CACHE_COLONNE ", this, &EntryScreen::ctrl_cache_colonne);
  handlers.add("AVANT_DEBUT", this, &EntryScreen::avant_debut);
  handlers.add("DEBUT", this, &EntryScreen::debut);
  handlers.add("SELECTION_TRI", this, &EntryScreen::selection_tri);
  handlers.add("COMMANDE1", this, &EntryScreen::commande1);
  handlers.add("INFO_FICHE", this, &EntryScreen::info_fiche);
  handlers.add("CONSTITUER_INFO_FICHE", this, &EntryScreen::constituer_info_fiche);
  handlers.add("COMPLETER_INFO_FICHE", this, &EntryScreen::completer_info_fiche);
  handlers.add("IMPRIME", this, &EntryScreen::imprime);
  handlers.add("IMPR_FICHE", this, &EntryScreen::impr_fiche);
  handlers.add("MODIFICATION", this, &EntryScreen::modification);
  handlers.add("CREAT2", this, &EntryScreen::creat2);
  handlers.add("DEBUT_VISUALISATION", this, &EntryScreen::debut_visualisation);
  handlers.add("DEBUT_MODIFICATION", this, &EntryScreen::debut_modification);
  handlers.add("DEBUT_CREATION", this, &EntryScreen::debut_creation);
  handlers.add("APRES_DEBUT_CREATION", this, &EntryScreen::apres_debut_creation);
  handlers.add("FIN_CREATION", this, &EntryScreen::fin_creation);
  handlers.add("IMPORTATION_LIGNES", this, &EntryScreen::importation_lignes);
  handlers.add("DEBUT_FICHE", this, &EntryScreen::debut_fiche);
  handlers.add("DTOPE", this, &EntryScreen::dtope);
  handlers.add("CONTROLER_COMPT", this, &EntryScreen::controler_compt);
  handlers.add("NPIEC_ENTREE", this, &EntryScreen::npiec_entree);
  handlers.add("NPIEC", this, &EntryScreen::npiec);
  handlers.add("PREFIXE_NUMERO_PIECE", this, &EntryScreen::prefixe_numero_piece);
  handlers.add("INPIE_ENTREE", this, &EntryScreen::inpie_entree);
  handlers.add("PREFIXE_INTITULE_PIECE", this, &EntryScreen::prefixe_intitule_piece);
  handlers.add("P1_SORTIE", this, &EntryScreen::p1_sortie);
  handlers.add("GRP1_SORTIE", this, &EntryScreen::grp1_sortie);
  handlers.add("CONTROLER_P1", this, &EntryScreen::controler_p1);
  handlers.add("CONTROLER_GRP1", this, &EntryScreen::controler_grp1);
  handlers.add("SELECTION", this, &EntryScreen::selection);
  handlers.add("CTRL_DEBUT_LIGNE", this, &EntryScreen::ctrl_debut_ligne);
  handlers.add("DEBUT_CREATION_LIGNE", this, &EntryScreen::debut_creation_ligne);
  handlers.add("GESTION_ANALY_OUI_NON", this, &EntryScreen::gestion_analy_oui_non);
  handlers.add("LST_ENTREE", this, &EntryScreen::lst_entree);
  handlers.add("INCREMENTE_NUMERO_PIECE", this, &EntryScreen::incremente_numero_piece);
  handlers.add("V_SAISIE_COMPT2_FERME", this, &EntryScreen::v_saisie_compt2_ferme);
  handlers.add("V_SAISIE_COMPT", this, &EntryScreen::v_saisie_compt);
  handlers.add("SAISIE_MTT", this, &EntryScreen::saisie_mtt);
  handlers.add("LST_MIRVAL.NUMCP", this, &EntryScreen::lst_mirval_numcp);
  handlers.add("LST_V_HT", this, &EntryScreen::lst_v_ht);
  handlers.add("LST_MIRVAL.COTVA", this, &EntryScreen::lst_mirval_cotva);
  handlers.add("CDTVA_CHOISIR", this, &EntryScreen::cdtva_choisir);
  handlers.add("LST_MIRVAL.TVA", this, &EntryScreen::lst_mirval_tva);
  handlers.add("CALCUL_MTT_LIGNE", this, &EntryScreen::calcul_mtt_ligne);
  handlers.add("CALCUL_TVA_SELON_HT", this, &EntryScreen::calcul_tva_selon_ht);
  handlers.add("CALCUL_TVA_SELON_TTC", this, &EntryScreen::calcul_tva_selon_ttc);
  handlers.add("CALCUL_TTC", this, &EntryScreen::calcul_ttc);
  handlers.add("CALCUL_HT", this, &EntryScreen::calcul_ht);
  handlers.add("B_VALID_DOC", this, &EntryScreen::b_valid_doc);
  handlers.add("VALID_DOC", this, &EntryScreen::valid_doc);
  handlers.add("VALIDATION", this, &EntryScreen::validation);
  handlers.add("CONTROLER_LST", this, &EntryScreen::controler_lst);
  handlers.add("APRES_VALIDATION", this, &EntryScreen::apres_validation);
  handlers.add("AVANT_SUPPRESSION", this, &EntryScreen::avant_suppression);
  handlers.add("B_ABAND_DOC", this, &EntryScreen::b_aband_doc);
  handlers.add("VALIDATION_LIGNE", this, &EntryScreen::validation_ligne);
  handlers.add("APRES_VALIDATION_LIGNE", this, &EntryScreen::apres_validation_ligne);
  handlers.add("APRES_SUPPRESSION_LIGNE", this, &EntryScreen::apres_suppression_ligne);
  handlers.add("BT_ANALYTIQUE", this, &EntryScreen::bt_analytique);
  handlers.add("APPEL_ANALYTIQUE", this, &EntryScreen::appel_analytique);
  handlers.add("EXTRACTION_DONNEES", this, &EntryScreen::extraction_donnees);
  handlers.add("EXTRACTION_TABLE_MIRVAANA", this, &EntryScreen::extraction_table_mirvaana);
  handlers.add("SUPPRESSION_DONNEES", this, &EntryScreen::suppression_donnees);
  handlers.add("SUPPRESSION_TABLE_MIRVAANA", this, &EntryScreen::suppression_table_mirvaana);
  handlers.add("VALIDATION_DONNEES", this, &EntryScreen::validation_donnees);
  handlers.add("VALIDATION_TABLE_MIRVAANA", this, &EntryScreen::validation_table_mirvaana);
  handlers.add("CTRL_CHOISIR", this, &EntryScreen::ctrl_choisir);
  handlers.add("CTRL_OUVRE", this, &EntryScreen::ctrl_ouvre);
  handlers.add("DIALOGUE", this, &EntryScreen::dialogue);
  handlers.add("MONNAIE_CHOISIR", this, &EntryScreen::monnaie_choisir);
  handlers.add("MONNAIE_IDENT", this, &EntryScreen::monnaie_ident);
  handlers.add("COURS", this, &EntryScreen::cours);
  handlers.add("CTRL_BASCULER", this, &EntryScreen::ctrl_basculer);
  handlers.add("CTRL_ACTUALISER_MODE", this, &EntryScreen::ctrl_actualiser_mode);
  handlers.add("CTRL_ACTUALISER_BASCULE", this, &EntryScreen::ctrl_actualiser_bascule);
  handlers.add("ACTUALISER_INFO_MONETAIRES", this, &EntryScreen::actualiser_info_monetaires);
  handlers.add("DEFINIR_BASCULE", this, &EntryScreen::definir_bascule);
  handlers.add("MAJ_LIGNES_MEMOIRE", this, &EntryScreen::maj_lignes_memoire);
}

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

bool EntryScreen::chooseStandardText(const char* module, Table& table, Champ& code, Champ& label, Donnee& target) {
  if (enVisualisation()) {
    messageOk("Opération interdite en mode visualisation !");
    return false;
  }
  Chaine PIDENT("PIDENT", "", "", 4, this), PERREUR("PERREUR", "", "", 4, this);
  EvtParamRef choix(2, &PIDENT, &PERREUR);
  appelerModule("COMPTA", "COMPTA", module, &choix);
  EvtParamVal liste(1, "LST");
  procedure("CTRL_DEBUT_MODIF_LISTE", &liste);
  if (PERREUR == "0") {
    lireOuVider(table, code, PIDENT);
    target = label;
  } else if (PERREUR == "2") {
    target = "";
  }
  return true;
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
      // The first of the kind's treasury accounts, by number.
      Champ cptre("CPTRE", &JONAL);
      COMPT.initRequete();
      COMPT.ajouteFiltre(COMPT_NATUC, '?', kind_.headerNature);
      COMPT.ajouteFiltre(COMPT_CCTRA, '#', "O");
      COMPT.choisitIndex("NUMCP");
      COMPT.activeRequete();
      bool found = COMPT.suivant(3) == 0 && JONAL.lit(3, cptre, '=', COMPT_NUMCP) == 0;
      COMPT.initRequete();
      if (!found) JONAL.raz();
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

  openLineSelections();

  ecran()->commande(1, "Infos fiche");
  for (Part* part : parts_) part->started();
}

void EntryScreen::openLineSelections() {
  line().openSelection();
  CDTVA.initRequete();
  if (kind_.vatCodeFilter) CDTVA.ajouteFiltre(CDTVA_TYTVA, kind_.vatCodeFilter, kind_.vatCodeType);
  CDTVA.choisitIndex("COTVA");
  CDTVA.activeRequete();
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
  if (JONAL_PREFIXIN.estVide()) MIRVAE_INPIE = defaultLabel();
  // The copy has no ledger piece of its own.
  MIRVAE_NPIES = "";
  Gestion_document2::creation2(e);
}

void EntryScreen::debut_visualisation(Evt* e) { Saisie::debut_visualisation(e); }

void EntryScreen::debut_modification(Evt* e) {
  Saisie::debut_modification(e);
  // A saved operation keeps its journal: its piece was numbered there.
  ecran()->interdit("NUMJL", "");
  for (Part* part : parts_) part->modificationStarted();
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

  if (JONAL_PREFIXIN.estVide()) MIRVAE_INPIE = defaultLabel();
  switch (kind_.dueDate) {
    case registry::CreationDueDate::OperationDate: MIRVAE_DTECH = MIRVAE_DTOPE; break;
    case registry::CreationDueDate::Today: MIRVAE_DTECH = Date::dateCourante(); break;
    case registry::CreationDueDate::None: break;
  }
  MIRVAE_COURS = euro().cours(MIRVAE_MONNAIE_IDENT.chaine(), MIRVAE_DTOPE.jour());

  MIRVAE_SAISIE_MTT = kind_.amountTyped;
  procedure("SAISIE_MTT");
  for (Part* part : parts_) part->creationStarted();
}

void EntryScreen::apres_debut_creation(Evt* e) {
  Sdocum::apres_debut_creation(e);
  if (!IDENT_ORIGINE.estVide()) procedure("IMPORTATION_LIGNES");
  for (Part* part : parts_) part->creationShown();
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
  for (Part* part : parts_) part->opened();
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
    if (V_CHOIX == "1" || V_CHOIX == "3") {
      V_CREAT_ACTIF = 0;
    } else if (V_CHOIX == "2") {
      V_CREAT_ACTIF = 1;
    } else {
      controler("");
      rejeter(e);
      return;
    }
    for (Part* part : parts_) part->choiceMade(V_CHOIX.chaine());
  }
  // Each check shows its message and puts the focus on the faulty control itself.
  for (const char* check : {"CONTROLER_P1", "CONTROLER_GRP1", "CONTROLER_LST"}) {
    procedure(check);
    if (erreurMethode() != 0) {
      rejeter(e);
      return;
    }
  }
  for (Part* part : parts_)
    if (!part->documentAccepted(e)) {
      rejeter(e);
      return;
    }
  for (Part* part : parts_) part->saving();
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
  for (Part* part : parts_) part->saved();
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
  for (Part* part : parts_) part->lineExtracted();
}

void EntryScreen::validation_donnees(Evt* e) {
  procedure("VALIDATION_TABLE_MIRVAANA");
  for (Part* part : parts_) part->lineSaved();
  Sdocum::validation_donnees(e);
}

void EntryScreen::suppression_donnees(Evt* e) {
  procedure("SUPPRESSION_TABLE_MIRVAANA");
  for (Part* part : parts_) part->lineDeleted();
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
