#include "entry/parts.h"
#include "host/currency.h"

namespace entry {

TreasuryAccount::TreasuryAccount(EntryScreen& screen) : HeaderAccount(screen) {}

void TreasuryAccount::provide(Handlers& handlers) {
  HeaderAccount::provide(handlers);
  handlers.add("TYPE_DR", this, &TreasuryAccount::type_dr);
  handlers.add("CALCUL_SOLDE", this, &TreasuryAccount::calcul_solde);
  handlers.add("AFFICHER_SOLDE", this, &TreasuryAccount::afficher_solde);
}

// The accounts offered by number; the first one and its journal are proposed.
void TreasuryAccount::started() {
  COMPT1.initRequete();
  COMPT1.ajouteFiltre(COMPT1_NATUC, '?', nature());
  COMPT1.ajouteFiltre(COMPT1_CCTRA, '#', "O");
  COMPT1.choisitIndex("NUMCP");
  COMPT1.activeRequete();
  if (COMPT1.suivant(3) != 0) COMPT1.raz();
  readJournal();
}

// The core gave the new operation the journal of the first account: the account
// is that journal's.
void TreasuryAccount::creationStarted() {
  MIRVAE_TYPE_DR = "R";
  V_NUMJL = s_.JONAL_NUMJL;
  V_CPTRE = JONAL_CPTRE;
  s_.MIRVAE_NUMJL = V_NUMJL;
  s_.MIRVAE_NUMCP = V_CPTRE;
  VLIBCP1 = EntryScreen::lireOuVider(COMPT1, COMPT1_NUMCP, V_CPTRE) ? COMPT1_LIBCP.chaine() : std::string();
  V_TOT1_DR = 0;
  V_TOT2_DR = 0;
  s_.procedure("CALCUL_SOLDE");
}

void TreasuryAccount::opened() {
  HeaderAccount::opened();
  readJournal();
  s_.procedure("CALCUL_SOLDE");
}

bool TreasuryAccount::readJournal() {
  bool found = !COMPT1_NUMCP.estVide() && EntryScreen::lireOuVider(s_.JONAL, JONAL_CPTRE, COMPT1_NUMCP);
  if (!found) s_.JONAL.raz();
  V_NUMJL = s_.JONAL_NUMJL;
  V_CPTRE = JONAL_CPTRE;
  return found;
}

std::string TreasuryAccount::lineNature() const {
  if (PARAM_PRE19 == "1") return payment() ? "H" : "P";
  return payment() ? "F" : "C";
}

std::string TreasuryAccount::lineAccountRequired() const {
  if (PARAM_PRE19 != "1") return "La saisie d'un compte Tiers est obligatoire !";
  return payment() ? "La saisie d'un compte Charge est obligatoire !"
                   : "La saisie d'un compte Produit est obligatoire !";
}

// A pattern is for the choice window: the line takes one account.
bool TreasuryAccount::lineAccountAccepted(Evt* e, const std::string& account) {
  if (!account.ends_with('*')) return true;
  s_.refuser(e, "Vous devez choisir un n° de compte", "LST_MIRVAL.NUMCP");
  return false;
}

// A line carries VAT only on an account that takes it, and only when the dossier
// manages VAT; otherwise the line has no VAT code left behind either.
void TreasuryAccount::lineAccountRead() {
  bool vat = s_.TVA_GR_ACTIF == 1 && s_.line().NATUC().chaine().find('U') != std::string::npos;
  if (vat) {
    s_.ecran()->autorise("LST_MIRVAL.COTVA", "LST_MIRVAL.TVA", "CDTVA_CHOISIR", "");
    return;
  }
  s_.ecran()->interdit("LST_MIRVAL.COTVA", "LST_MIRVAL.TVA", "CDTVA_CHOISIR", "");
  if (s_.MIRVAL_COTVA.estVide() && s_.MIRVAL_TVA == 0) return;
  s_.MIRVAL_COTVA = "";
  s_.MIRVAL_TXTVA = 0;
  s_.procedure("CALCUL_MTT_LIGNE");
}

// What the operation takes out of the account and what it brings in.
void TreasuryAccount::linesTotalled(const Decimal& ttc) {
  V_TOT1_DR = payment() ? ttc : Decimal();
  V_TOT2_DR = payment() ? Decimal() : ttc;
  s_.procedure("AFFICHER_SOLDE");
}

void TreasuryAccount::vlibcp1(Evt* e) {
  HeaderAccount::vlibcp1(e);
  if (e && e->rejete()) return;
  if (!s_.MIRVAE_NUMCP.estVide()) {
    if (!readJournal()) {
      s_.MIRVAE_NUMCP = "";
      return s_.refuser(e, s_.kind().accountWithoutJournal, "VLIBCP1");
    }
    // A new operation is numbered in the journal of its account; a saved one keeps
    // the journal its piece was numbered in.
    if (s_.enCreation()) s_.MIRVAE_NUMJL = V_NUMJL;
  }
  s_.procedure("CALCUL_SOLDE");
}

// The direction turns what the lines come to into an inflow or an outflow.
void TreasuryAccount::type_dr(Evt*) { s_.procedure("CALCUL_TOTAUX"); }

void TreasuryAccount::calcul_solde(Evt*) {
  Decimal balance;
  if (!s_.MIRVAE_NUMCP.estVide()) {
    Monnaie V_MTDEB("V_MTDEB", "", "", 4, &s_), V_MTCRE("V_MTCRE", "", "", 4, &s_);
    EvtParamRef cumuls(7, &s_.MIRVAE_NUMCP, "C", &s_.PARAM_PDDEX, &s_.DATE_CLOTURE, &V_MTDEB, &V_MTCRE,
                       &s_.PARAM_MONNAIE_IDENT);
    s_.appelerProcedure("", "COMPTA", "MOD_CAL_BIBLIOPROC", "CALCUL_CUMULS_COMPTE", &cumuls, -1);
    balance = V_MTDEB.decimal() - V_MTCRE.decimal();
    // The operation's own piece is replaced when it is saved: the operation counts
    // as it now stands, through the totals, and not twice.
    if (!s_.MIRVAE_NPIES.estVide()) {
      Table mouve(&s_, "", "MOUVE", "MOUVE_SOLDE");
      Champ npies("NPIES", &mouve), numcp("NUMCP", &mouve), dtope("DTOPE", &mouve), mtdeb("MTDEB", &mouve),
          mtcre("MTCRE", &mouve);
      mouve.initRequete();
      mouve.ajouteFiltre(npies, '=', s_.MIRVAE_NPIES);
      mouve.ajouteFiltre(numcp, '=', s_.MIRVAE_NUMCP);
      mouve.activeRequete();
      for (int rc = mouve.suivant(3); rc == 0; rc = mouve.suivant(1))
        if (!(dtope < s_.PARAM_PDDEX) && !(dtope > s_.DATE_CLOTURE)) balance -= mtdeb.decimal() - mtcre.decimal();
      mouve.initRequete();
    }
    // The ledger keeps the dossier's currency; the lines are in the operation's.
    const std::string keeping = s_.PARAM_MONNAIE_IDENT.chaine(), current = s_.MIRVAE_MONNAIE_IDENT.chaine();
    if (!current.empty() && current != keeping)
      balance = euro().arrondir(euro().convertir(balance, keeping, current, s_.MIRVAE_DTOPE.jour()), current);
  }
  V_SOLDE_INITIAL = balance;
  s_.procedure("AFFICHER_SOLDE");
}

void TreasuryAccount::afficher_solde(Evt*) {
  const registry::ShownBalance shown =
      registry::shownBalance(V_SOLDE_INITIAL.decimal() - V_TOT1_DR.decimal() + V_TOT2_DR.decimal());
  V_SOLDE = shown.amount;
  V_TSOLDE = shown.side;
  s_.ecran()->affiche("V_SOLDE", "");
  s_.ecran()->affiche("V_TSOLDE", "");
}

void TreasuryAccount::amountsConverted(const std::string& line,
                                       const std::function<Decimal(const Decimal&)>& convert) {
  if (line.empty()) V_SOLDE_INITIAL = convert(V_SOLDE_INITIAL.decimal());
}

}  // namespace entry
