#include "entry/gestion3.h"

#include "host/text.h"

using host::Chaine;
using host::Evt;
using host::EvtParamRef;
using host::EvtParamVal;

namespace entry {

StaffOrSupplier::StaffOrSupplier(EntryScreen& screen) : HeaderAccount(screen) {}

void StaffOrSupplier::provide(Handlers& handlers) {
  HeaderAccount::provide(handlers);
  handlers.add("VTIERS1", this, &StaffOrSupplier::vtiers1);
  handlers.add("VTIERS1_FERME", this, &StaffOrSupplier::vtiers1_ferme);
  handlers.add("FAIT_INPIE", this, &StaffOrSupplier::fait_inpie);
}

void StaffOrSupplier::started() {
  HeaderAccount::started();
  COMPT1P.initRequete();
  COMPT1P.ajouteFiltre(COMPT1P_NUMCP, '/', "421");
  COMPT1P.ajouteFiltre(COMPT1P_NATUC, '?', "A");
  COMPT1P.ajouteFiltre(COMPT1P_CCTRA, '#', "O");
  COMPT1P.choisitIndex("LIBCP");
  COMPT1P.activeRequete();
  COMPT1F.initRequete();
  COMPT1F.ajouteFiltre(COMPT1F_NATUC, '?', "F");
  COMPT1F.ajouteFiltre(COMPT1F_CCTRA, '#', "O");
  COMPT1F.choisitIndex("LIBCP");
  COMPT1F.activeRequete();
}

void StaffOrSupplier::creationStarted() {
  VTIERS = "P";
  VTIERS_ANC = VTIERS;
  HeaderAccount::started();
  s_.procedure("FAIT_INPIE");
}

// A saved note does not keep its type of counterparty: its account tells it.
void StaffOrSupplier::opened() {
  HeaderAccount::opened();
  if (s_.MIRVAE_NUMCP.estVide()) return;
  VTIERS = s_.MIRVAE_NUMCP.chaine().starts_with("421") ? "P" : "F";
  VTIERS_ANC = VTIERS;
  HeaderAccount::started();
}

void StaffOrSupplier::compt1_choisir(Evt* e) {
  if (s_.enVisualisation()) {
    s_.messageOk("Opération interdite en mode visualisation !");
    return;
  }
  if (VTIERS.estVide()) {
    s_.messageOk("La saisie d'un type de tiers est obligatoire !");
    return;
  }
  if (VTIERS != "P") return HeaderAccount::compt1_choisir(e);
  // Staff accounts are chosen by number among those beginning with 421.
  Chaine pattern("421*");
  EvtParamRef choix(5, &VNUMCP1, &pattern, "A", "NUMCP", "N");
  s_.appelerProcedure("*", "CPCOMPT", "INTERFACE", "CHOIX_INTITULE_REDUIT", &choix, -1);
  if (s_.erreurMethode() == 0 && COMPT1P.lit(3, COMPT1P_NUMCP, '=', VNUMCP1) == 0) VLIBCP1 = COMPT1P_LIBCP;
  s_.enFile("VLIBCP1");
}

void StaffOrSupplier::vtiers1(Evt*) { s_.procedure("VTIERS1_FERME"); }

void StaffOrSupplier::vtiers1_ferme(Evt*) {
  if (VTIERS != VTIERS_ANC) {
    // The account typed was of the other type: it goes, and the choice follows the new type.
    HeaderAccount::started();
    VLIBCP1 = "";
    s_.enFile("VLIBCP1");
  }
  s_.enFile("FAIT_INPIE");
  VTIERS_ANC = VTIERS;
}

void StaffOrSupplier::fait_inpie(Evt*) {
  s_.lireJournal();
  if (!s_.JONAL_PREFIXIN.estVide()) return;
  s_.MIRVAE_INPIE = label();
  s_.ecran()->affiche("INPIE", "");
}

std::string StaffOrSupplier::label() const {
  if (VTIERS == "P") return std::string("Note de frais personnel n° ") + host::text::kPiecePlaceholder;
  if (VTIERS == "F") return std::string("Facture frais fournisseur n° ") + host::text::kPiecePlaceholder;
  return "";
}

}  // namespace entry

MIRVAEGestion3::MIRVAEGestion3(Evt* e) : EntryScreen(e, registry::operationKind(3)) {
  registerBranches(entry::branchesWithout(
      entry::kInvoiceBranches, entry::EntryModels::kBranches,
      {"VTIERS1", "VTIERS1_FERME", "FAIT_INPIE", "TYPFR_CHOISIR", "LST_MIRVAL.LIBEC", "LIRE_LIGNE_PRECEDENTE"}));
}

void MIRVAEGestion3::provide(entry::Handlers& handlers) {
  EntryScreen::provide(handlers);
  handlers.add("TYPFR_CHOISIR", this, &MIRVAEGestion3::typfr_choisir);
  handlers.add("LST_MIRVAL.LIBEC", this, &MIRVAEGestion3::lst_mirval_libec);
  handlers.add("LIRE_LIGNE_PRECEDENTE", this, &MIRVAEGestion3::lire_ligne_precedente);
}

void MIRVAEGestion3::ctrl_ouvre(Evt* e) {
  if (e->nbParams() > 0 && e->parametre(0) == "LST_MIRVAL.LIBEC") return procedure("TYPFR_CHOISIR");
  EntryScreen::ctrl_ouvre(e);
}

// The line label from the expense types.
void MIRVAEGestion3::typfr_choisir(Evt*) {
  if (!chooseStandardText("CHOIX_TABLE_TYPFR", TYPFR, TYPFR_CTYFR, TYPFR_ITYFR, MIRVAL_LIBEC)) return;
  afficherLigne();
}

// A label of one blank repeats the previous line's.
void MIRVAEGestion3::lst_mirval_libec(Evt*) {
  if (MIRVAL_LIBEC.chaine() != " ") return;
  procedure("LIRE_LIGNE_PRECEDENTE");
  if (erreurMethode() == 0) MIRVAL_LIBEC = MEM_MIRVAL_LIBEC;
  afficherLigne();
}

// Puts MEM_MIRVAL on the line before the one being typed (the last line for a new
// one); the method result is 1 when there is none.
void MIRVAEGestion3::lire_ligne_precedente(Evt* e) {
  erreurMethode(1, e);
  std::string previous;
  MEM_MIRVAL.initRequete();
  MEM_MIRVAL.ajouteFiltre(MEM_MIRVAL_NUMERO, '/', MIRVAE_IDENT.chaine() + "|");
  MEM_MIRVAL.choisitIndex("NUMERO");
  MEM_MIRVAL.activeRequete();
  for (int rc = MEM_MIRVAL.suivant(3); rc == 0; rc = MEM_MIRVAL.suivant(1)) {
    if (!MIRVAL_IDENT.estVide() && MEM_MIRVAL_IDENT == MIRVAL_IDENT) break;
    previous = MEM_MIRVAL_IDENT.chaine();
  }
  MEM_MIRVAL.initRequete();
  if (previous.empty() || MEM_MIRVAL.lit(3, MEM_MIRVAL_IDENT, '=', previous) != 0) return;
  erreurMethode(0, e);
}
