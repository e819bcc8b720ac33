#include "printing/impr.h"

#include "host/text.h"

namespace printing {

using namespace host;

namespace {

// The accounts library reads `number` into I_CPCOMPT; `accounts`, the job's binding
// of it, is then on that record (blank for an account it could not read).
void readAccount(Automate& job, Donnee& number, Table& accounts) {
  EvtParamRef evt(1, &number);
  job.appelerProcedure("*1", "CPCOMPT", "INTERFACE", "LECTURE", &evt, -1);
  accounts.initRequete();
  accounts.activeRequete();
  if (accounts.suivant(3) != 0) accounts.raz();
}

// The dossier parameters library loads its parameters.
void readParameters(Automate& job) {
  EvtParamVal empty(new InfoCode(0, 0, 0, 0, 0, 0));
  job.appelerProcedure("*1", "CPPARAM", "INTERFACE", "LECTURE", &empty, -1);
}

}  // namespace

// ---------------------------------------------------------------------------- forms

AccountFormPrint::AccountFormPrint(Evt* e) : Edition_etat2(e) {
  nomBase("CP");
  nomTable("MIRVAE", nullptr);
}

void AccountFormPrint::registerBranches() {
  addBranch("DEBUT", &AccountFormPrint::debut);
  addBranch("DEBUT_FICHE", &AccountFormPrint::debut_fiche);
  addBranch("LST_CORPS_IMPRIME", &AccountFormPrint::lst_corps_imprime);
}

void AccountFormPrint::debut(Evt* e) {
  readParameters(*this);
  Edition_etat2::debut(e);
}

void AccountFormPrint::debut_fiche(Evt* e) {
  Impetat::debut_fiche(e);
  readAccount(*this, NUMCP, I_CPCOMPT);
  VNOM = LIBCP;
  VADRESSE = ADRE1;
  VADRESSE2 = ADRE2;
  VCPVILLE = CPOCP + " " + VILCP;
}

void AccountFormPrint::lst_corps_imprime(Evt*) {
  readAccount(*this, MIRVAL_NUMCP, I_CPCOMPT);
  VLIBCP = LIBCP;
}

MIRVAEImpr_fiche6::MIRVAEImpr_fiche6(Evt* e) : Edition_etat2(e) {
  nomBase("CP");
  nomTable("MIRVAE", nullptr);
  addBranch("DEBUT", &MIRVAEImpr_fiche6::debut);
  addBranch("DEBUT_FICHE", &MIRVAEImpr_fiche6::debut_fiche);
  addBranch("LST_CORPS_IMPRIME", &MIRVAEImpr_fiche6::lst_corps_imprime);
}

void MIRVAEImpr_fiche6::debut(Evt* e) {
  readParameters(*this);
  Edition_etat2::debut(e);
}

void MIRVAEImpr_fiche6::debut_fiche(Evt* e) { Impetat::debut_fiche(e); }

void MIRVAEImpr_fiche6::lst_corps_imprime(Evt*) {
  readAccount(*this, MIRVAL_NUMCP, I_CPCOMPT);
  VLIBCP = LIBCP;
}

// ---------------------------------------------------------------------------- lists

ListPrint::ListPrint(Evt* e) : Edition_etat2(e) {
  nomBase("CP");
  nomTable("MIRVAE", nullptr);
}

void ListPrint::cherche(Evt* e) {
  Chaine P_CRITERE("P_CRITERE", "", "", 4, nullptr);
  Chaine P_VALEUR("P_VALEUR", "", "", 4, nullptr);
  Entier I("I", "", "", 4, nullptr);
  e->param(0, P_CRITERE, 0);
  e->param(1, P_VALEUR, 1);
  std::string marker = P_CRITERE.chaine() + " '";
  const std::string request = VREQUETE_SQL.chaine();
  I = static_cast<long long>(text::position(request, marker));
  if (I.entier() != 0) {
    I = I.entier() + static_cast<long long>(text::length(marker));
    P_VALEUR = text::substring(request, static_cast<long>(I.entier()), static_cast<long>(text::length(request)));
    const std::string rest = P_VALEUR.chaine();
    P_VALEUR = text::substring(rest, 1, static_cast<long>(text::position(rest, "'")) - 1);
  } else {
    P_VALEUR = "";
  }
}

void ListPrint::find(const char* criterion, Chaine& value) {
  EvtParamRef evt(2, criterion, &value);
  appelerProcedure("", "", "", "CHERCHE", &evt, 0);
}

void ListPrint::readPeriod() {
  VREQUETE_SQL = table(false)->requete();
  find("DTOPE >=", VDATEMIN);
  VDATEMIN = VDATEMIN == "" ? std::string("...") : Date::eDate(VDATEMIN.chaine(), "/");
  find("DTOPE <=", VDATEMAX);
  VDATEMAX = VDATEMAX == "" ? std::string("31/12/9999") : Date::eDate(VDATEMAX.chaine(), "/");
}

AccountListPrint::AccountListPrint(Evt* e) : ListPrint(e) {}

void AccountListPrint::registerBranches() {
  addBranch("DEBUT", &AccountListPrint::debut);
  addBranch("CHERCHE", &AccountListPrint::cherche);
  addBranch("LST_CORPS_IMPRIME", &AccountListPrint::lst_corps_imprime);
}

void AccountListPrint::debut(Evt* e) {
  Edition_etat2::debut(e);
  readParameters(*this);
  readPeriod();
  VLIBCP = "";
  find("NUMCP =", VNUMCP);
  if (VNUMCP != "") {
    readAccount(*this, VNUMCP, I_CPCOMPT);
    VLIBCP = LIBCP;
  }
}

void AccountListPrint::lst_corps_imprime(Evt*) {
  readAccount(*this, NUMCP, I_CPCOMPT);
  VLIBCP1 = LIBCP;
}

TreasuryListPrint::TreasuryListPrint(Evt* e) : ListPrint(e) {}

void TreasuryListPrint::registerBranches() {
  addBranch("DEBUT", &TreasuryListPrint::debut);
  addBranch("CHERCHE", &TreasuryListPrint::cherche);
  addBranch("LST_DEBUT1_IMPRIME", &TreasuryListPrint::lst_debut1_imprime);
  addBranch("LST_DEBUT_FICHE", &TreasuryListPrint::lst_debut_fiche);
}

void TreasuryListPrint::debut(Evt* e) {
  Edition_etat2::debut(e);
  readParameters(*this);
  readPeriod();
  find("TYPE_DR =", VTYPE);
  VLIBCP = "";
  find("NUMCP =", VNUMCP);
  if (VNUMCP != "") {
    readAccount(*this, VNUMCP, I_CPCOMPT);
    VLIBCP = LIBCP;
  }
}

void TreasuryListPrint::lst_debut1_imprime(Evt*) {
  readAccount(*this, NUMCP, I_CPCOMPT);
  VLIBCP1 = LIBCP;
}

void TreasuryListPrint::lst_debut_fiche(Evt*) {
  if (TYPE_DR == "D") {
    VTYPE_DR = "Dépense";
    VTTC = -TTC.decimal();
    VTVA = -TVA.decimal();
    VHT = -HT.decimal();
  } else if (TYPE_DR == "R") {
    VTYPE_DR = "Recette";
    VTTC = TTC.decimal();
    VTVA = TVA.decimal();
    VHT = HT.decimal();
  }
}

MIRVAEImpr_liste6::MIRVAEImpr_liste6(Evt* e) : ListPrint(e) {
  addBranch("DEBUT", &MIRVAEImpr_liste6::debut);
  addBranch("CHERCHE", &MIRVAEImpr_liste6::cherche);
  addBranch("LST_CORPS_IMPRIME", &MIRVAEImpr_liste6::lst_corps_imprime);
}

void MIRVAEImpr_liste6::debut(Evt* e) {
  Edition_etat2::debut(e);
  readParameters(*this);
  readPeriod();
}

void MIRVAEImpr_liste6::lst_corps_imprime(Evt*) {}

}  // namespace printing
