// The account part of each kind's access screen.
#include "access/acces.h"

namespace browser {

using namespace host;

// ---------------------------------------------------------------------------- kinds 1 and 2

CounterpartyBrowser::CounterpartyBrowser(Evt* e, const registry::OperationKind& kind) : MIRVAEAcces(e, kind) {
  registerBranches([this] {
    addBranch("VNUMCP_TOUS", &CounterpartyBrowser::vnumcp_tous);
    addBranch("VLIBCP1", &CounterpartyBrowser::vlibcp1);
    addBranch("COMPT1_CHOISIR", &CounterpartyBrowser::compt1_choisir);
  });
}

void CounterpartyBrowser::openAccounts() {
  VNUMCP_TOUS = "O";
  COMPT1.initRequete();
  COMPT1.ajouteFiltre(COMPT1_NATUC, '?', kind_.headerNature, 'A');
  COMPT1.ajouteFiltre(COMPT1_CCTRA, '#', "O", 'A');
  COMPT1.choisitIndex("LIBCP", 'A');
  COMPT1.activeRequete();
}

void CounterpartyBrowser::filterOnAccounts(Table& main) {
  if (VNUMCP1) main.ajouteFiltre(NUMCP, '=', VNUMCP1, 'A');
}

void CounterpartyBrowser::describeRow(Evt*) { VLIBCP2 = rowAccountTitle(COMPT2, COMPT2_NUMCP, COMPT2_LIBCP); }

void CounterpartyBrowser::vnumcp_tous(Evt*) {
  if (VNUMCP_TOUS == "O") {
    VNUMCP1 = "";
    VLIBCP1 = "";
  }
  ecran()->affiche("P1", "");
  requery();
}

void CounterpartyBrowser::vlibcp1(Evt* e) {
  if (VLIBCP1 == "") {
    VNUMCP1 = "";
    VNUMCP_TOUS = "O";
  } else {
    if (COMPT1.lit(3, COMPT1_LIBCP, '=', VLIBCP1) != 0) {
      refuseInput(e, kind_.headerMissing, "VLIBCP1");
      return;
    }
    VNUMCP1 = COMPT1_NUMCP;
    VNUMCP_TOUS = "";
  }
  ecran()->affiche("P1", "");
  requery();
}

void CounterpartyBrowser::compt1_choisir(Evt*) {
  EvtParamRef evt(5, &VLIBCP1, &COMPT1_LIBCP, kind_.headerNature, "LIBCP", "N");
  appelerProcedure("*", "CPCOMPT", "INTERFACE", "CHOIX_INTITULE_REDUIT", &evt, -1);
  appelerProcedure("", "", "", "VLIBCP1", nullptr, 0);
}

// ---------------------------------------------------------------------------- kind 3

namespace {
// Staff accounts are the "421" accounts of nature "A"; the suppliers are of nature "F".
constexpr const char* kStaffPrefix = "421";
constexpr const char* kStaffNature = "A";
constexpr const char* kSupplierNature = "F";
}  // namespace

MIRVAEAcces3::MIRVAEAcces3(Evt* e) : MIRVAEAcces(e, registry::operationKind(3)) {
  registerBranches([this] {
    addBranch("VNUMCP_TOUS", &MIRVAEAcces3::vnumcp_tous);
    addBranch("VLIBCP1P", &MIRVAEAcces3::vlibcp1p);
    addBranch("COMPT1P_CHOISIR", &MIRVAEAcces3::compt1p_choisir);
    addBranch("VLIBCP1F", &MIRVAEAcces3::vlibcp1f);
    addBranch("COMPT1F_CHOISIR", &MIRVAEAcces3::compt1f_choisir);
  });
}

MIRVAEAcces3::Side MIRVAEAcces3::staff() {
  return {VNUMCP1P, VLIBCP1P, COMPT1P, COMPT1P_NUMCP, COMPT1P_LIBCP, "P", "Le compte Personnel est inexistant !",
          "VLIBCP1P"};
}

MIRVAEAcces3::Side MIRVAEAcces3::supplier() {
  return {VNUMCP1F, VLIBCP1F, COMPT1F, COMPT1F_NUMCP, COMPT1F_LIBCP, "F", "Le compte Fournisseur est inexistant !",
          "VLIBCP1F"};
}

void MIRVAEAcces3::openAccounts() {
  VNUMCP_TOUS = "T";
  COMPT1P.initRequete();
  COMPT1P.ajouteFiltre(COMPT1P_NUMCP, '/', kStaffPrefix, 'A');
  COMPT1P.ajouteFiltre(COMPT1P_NATUC, '?', kStaffNature, 'A');
  COMPT1P.ajouteFiltre(COMPT1P_CCTRA, '#', "O", 'A');
  COMPT1P.choisitIndex("LIBCP", 'A');
  COMPT1P.activeRequete();
  COMPT1F.initRequete();
  COMPT1F.ajouteFiltre(COMPT1F_NATUC, '?', kSupplierNature, 'A');
  COMPT1F.ajouteFiltre(COMPT1F_CCTRA, '#', "O", 'A');
  COMPT1F.choisitIndex("LIBCP", 'A');
  COMPT1F.activeRequete();
}

void MIRVAEAcces3::filterOnAccounts(Table& main) {
  if (VNUMCP1P) main.ajouteFiltre(NUMCP, '=', VNUMCP1P, 'A');
  if (VNUMCP1F) main.ajouteFiltre(NUMCP, '=', VNUMCP1F, 'A');
}

void MIRVAEAcces3::describeRow(Evt*) { VLIBCP2 = rowAccountTitle(COMPT2, COMPT2_NUMCP, COMPT2_LIBCP); }

void MIRVAEAcces3::vnumcp_tous(Evt*) {
  if (VNUMCP_TOUS == "T") {
    VNUMCP1P = "";
    VLIBCP1P = "";
    VNUMCP1F = "";
    VLIBCP1F = "";
  }
  ecran()->affiche("P1", "");
  requery();
}

void MIRVAEAcces3::choose(Evt* e, const Side& side, const Side& other) {
  if (side.title == "") {
    side.number = "";
    VNUMCP_TOUS = "T";
  } else {
    if (side.accounts.lit(3, side.accountTitle, '=', side.title) != 0) {
      refuseInput(e, side.missing, side.control);
      return;
    }
    side.number = side.accountNumber;
    VNUMCP_TOUS = side.filter;
  }
  // Never both accounts: an operation has one counterparty, so the two filters
  // together would always give an empty list.
  other.number = "";
  other.title = "";
  ecran()->affiche("P1", "");
  requery();
}

void MIRVAEAcces3::vlibcp1p(Evt* e) { choose(e, staff(), supplier()); }

void MIRVAEAcces3::vlibcp1f(Evt* e) { choose(e, supplier(), staff()); }

void MIRVAEAcces3::compt1p_choisir(Evt*) {
  const std::string pattern = std::string(kStaffPrefix) + "*";
  EvtParamRef evt(5, &VNUMCP1P, pattern, kStaffNature, "NUMCP", "N");
  appelerProcedure("*", "CPCOMPT", "INTERFACE", "CHOIX_INTITULE_REDUIT", &evt, -1);
  VLIBCP1P = COMPT1P.lit(3, COMPT1P_NUMCP, '=', VNUMCP1P) == 0 ? COMPT1P_LIBCP.chaine() : std::string();
  appelerProcedure("", "", "", "VLIBCP1P", nullptr, 0);
}

void MIRVAEAcces3::compt1f_choisir(Evt*) {
  EvtParamRef evt(5, &VLIBCP1F, &COMPT1F_LIBCP, kSupplierNature, "LIBCP", "N");
  appelerProcedure("*", "CPCOMPT", "INTERFACE", "CHOIX_INTITULE_REDUIT", &evt, -1);
  appelerProcedure("", "", "", "VLIBCP1F", nullptr, 0);
}

// ---------------------------------------------------------------------------- kinds 4 and 5

TreasuryBrowser::TreasuryBrowser(Evt* e, const registry::OperationKind& kind) : MIRVAEAcces(e, kind) {
  registerBranches([this] {
    addBranch("VTYPE_DR", &TreasuryBrowser::vtype_dr);
    addBranch("VLIBCP1", &TreasuryBrowser::vlibcp1);
    addBranch("COMPT1_CHOISIR", &TreasuryBrowser::compt1_choisir);
    addBranch("CALCUL_SOLDE", &TreasuryBrowser::calcul_solde);
  });
}

void TreasuryBrowser::openAccounts() {
  COMPT1.initRequete();
  COMPT1.ajouteFiltre(COMPT1_NATUC, '?', kind_.headerNature, 'A');
  COMPT1.ajouteFiltre(COMPT1_CCTRA, '#', "O", 'A');
  COMPT1.choisitIndex("NUMCP", 'A');
  COMPT1.activeRequete();
  if (COMPT1.suivant(3) == 0) {
    VNUMCP1 = COMPT1_NUMCP;
    VLIBCP1 = COMPT1_LIBCP;
  }
  appelerProcedure("", "", "", "CALCUL_SOLDE", nullptr, 0);
}

void TreasuryBrowser::filterOnAccounts(Table& main) {
  if (VTYPE_DR) main.ajouteFiltre(TYPE_DR, '=', VTYPE_DR, 'A');
  if (VNUMCP1) main.ajouteFiltre(NUMCP, '=', VNUMCP1, 'A');
}

void TreasuryBrowser::describeRow(Evt* e) {
  if (VTYPE_DR && TYPE_DR != VTYPE_DR) {
    rejeter(e);
    return;
  }
  // A payment leaves the account: its amounts are shown as outflows.
  const bool payment = TYPE_DR == "D";
  V_TTC = payment ? -TTC.decimal() : TTC.decimal();
  V_TVA = payment ? -TVA.decimal() : TVA.decimal();
  V_HT = payment ? -HT.decimal() : HT.decimal();
}

void TreasuryBrowser::debut_activation(Evt*) {
  appelerProcedure("", "", "", "CALCUL_SOLDE", nullptr, 0);
  requery();
}

void TreasuryBrowser::vtype_dr(Evt*) { requery(); }

void TreasuryBrowser::vlibcp1(Evt* e) {
  if (VLIBCP1 == "") {
    VNUMCP1 = "";
    V_SOLDE = 0;
    V_TSOLDE = "";
  } else {
    if (COMPT1.lit(3, COMPT1_LIBCP, '=', VLIBCP1) != 0) {
      refuseInput(e, kind_.headerMissing, "VLIBCP1");
      return;
    }
    VNUMCP1 = COMPT1_NUMCP;
    appelerProcedure("", "", "", "CALCUL_SOLDE", nullptr, 0);
  }
  ecran()->affiche("P1", "");
  requery();
}

void TreasuryBrowser::compt1_choisir(Evt*) {
  EvtParamRef evt(5, &VNUMCP1, &COMPT1_NUMCP, kind_.headerNature, "NUMCP", "N");
  appelerProcedure("*", "CPCOMPT", "INTERFACE", "CHOIX_INTITULE_REDUIT", &evt, -1);
  if (COMPT1.lit(3, COMPT1_NUMCP, '=', VNUMCP1) != 0) COMPT1.raz();
  VNUMCP1 = COMPT1_NUMCP;
  VLIBCP1 = COMPT1_LIBCP;
  appelerProcedure("", "", "", "VLIBCP1", nullptr, 0);
}

void TreasuryBrowser::calcul_solde(Evt*) {
  // The balance is that of the account the list shows (none when no account is
  // chosen), over the exercise up to the closing date. The ledger gives it in the
  // keeping currency and it is shown in that currency: an operation opened in
  // another currency meanwhile must not change what the account holds.
  Decimal balance;
  if (VNUMCP1) {
    Monnaie V_MTDEB("V_MTDEB", "", "", 4, nullptr);
    Monnaie V_MTCRE("V_MTCRE", "", "", 4, nullptr);
    EvtParamRef evt(7, &VNUMCP1, "C", &PARAM_PDDEX, &DATE_CLOTURE, &V_MTDEB, &V_MTCRE, &PARAM_MONNAIE_IDENT);
    appelerProcedure("", "COMPTA", "MOD_CAL_BIBLIOPROC", "CALCUL_CUMULS_COMPTE", &evt, -1);
    balance = V_MTDEB.decimal() - V_MTCRE.decimal();
  }
  const registry::ShownBalance shown = registry::shownBalance(balance);
  V_SOLDE = shown.amount;
  V_TSOLDE = shown.side;
  ecran()->affiche("V_SOLDE", "");
  ecran()->affiche("V_TSOLDE", "");
}

// ---------------------------------------------------------------------------- kind 6

MIRVAEAcces6::MIRVAEAcces6(Evt* e) : MIRVAEAcces(e, registry::operationKind(6)) {
  registerBranches([] {});
}

}  // namespace browser
