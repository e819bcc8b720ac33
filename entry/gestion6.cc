#include "entry/gestion6.h"

#include <cctype>

#include "host/currency.h"

namespace entry {

namespace {

const char* senseLabel(const Donnee& sense) {
  if (sense == "D") return "Débit";
  if (sense == "C") return "Crédit";
  return "";
}

// Said when a line has no account yet: "La saisie d'un compte général est obligatoire !".
constexpr const char* kAnyNature = "général";

}  // namespace

// ---------------------------------------------------------------------------- line account

AnyAccount::AnyAccount(EntryScreen& screen) : LineAccount(screen, "LST_VLIBCP", "COMPT_CHOISIR") {
  bind({.number = &VNUMCP,
        .label = &VLIBCP,
        .accounts = &s_.COMPT,
        .NUMCP = &s_.COMPT_NUMCP,
        .LIBCP = &s_.COMPT_LIBCP,
        .NATUC = &s_.COMPT_NATUC,
        .CCTRA = &s_.COMPT_CCTRA,
        .COTVA = &COMPT_COTVA,
        .CPOST = &COMPT_CPOST,
        .CCRIT = &COMPT_CCRIT});
}

void AnyAccount::started() {
  s_.V_SAISIE_COMPT = "NUMCP";
  VLIBNATUC = kAnyNature;
}

void AnyAccount::lineAccountRead() {
  VLIBNATUC = s_.natureLabel(s_.COMPT_NATUC.chaine().substr(0, 1));
  Ecran* ecran = s_.ecran();
  if (vatAccount()) {
    // The amount of a VAT account is its VAT.
    ecran->interdit("LST_V_HT", "LST_MIRVAL.COTVA", "CDTVA_CHOISIR", "");
    ecran->autorise("LST_MIRVAL.TVA", "");
    s_.MIRVAL_COTVA = "";
    s_.MIRVAL_TXTVA = 0;
    s_.MIRVAL_HT = 0;
    s_.MIRVAL_TTC = s_.MIRVAL_TVA;
    s_.V_HT = 0;
    return;
  }
  ecran->autorise("LST_V_HT", "");
  if (s_.TVA_GR_ACTIF == 0) return;
  if (s_.COMPT_NATUC.chaine().find('U') != std::string::npos)
    ecran->autorise("LST_MIRVAL.COTVA", "LST_MIRVAL.TVA", "CDTVA_CHOISIR", "");
  else
    ecran->interdit("LST_MIRVAL.COTVA", "LST_MIRVAL.TVA", "CDTVA_CHOISIR", "");
}

// ---------------------------------------------------------------------------- totals

DebitCreditTotals::DebitCreditTotals(EntryScreen& screen) : Part(screen) {}

void DebitCreditTotals::provide(Handlers& handlers) {
  handlers.add("CALCUL_TOTAUX", this, &DebitCreditTotals::calcul_totaux);
}

// What the posting writes: a VAT account's VAT alone, any other account's amount
// excluding tax and its VAT, each on the line's side.
DebitCreditTotals::Sums DebitCreditTotals::sums() {
  Sums sums;
  s_.forEachLine([&](Table& line) {
    Decimal ht = line.valeur("HT").decimal(), tva = line.valeur("TVA").decimal();
    bool vat = s_.COMPT.lit(3, s_.COMPT_NUMCP, '=', line.valeur("NUMCP").chaine()) == 0 &&
               s_.COMPT_NATUC.chaine().find('T') != std::string::npos;
    Decimal posted = vat ? tva : ht + tva;
    (line.valeur("SENS_DC").chaine() == "D" ? sums.debit : sums.credit) += posted;
    sums.ht += ht;
    sums.tva += tva;
    sums.ttc += line.valeur("TTC").decimal();
  });
  return sums;
}

bool DebitCreditTotals::linesAccepted(Evt* e) {
  Sums posted = sums();
  if (posted.debit.isZero() && posted.credit.isZero()) {
    s_.refuser(e, "La saisie d'une pièce dont le total est nul n'est pas autorisée !", "");
    return false;
  }
  if (posted.debit == posted.credit) return true;
  int decimals = host::euro().decimales(s_.MIRVAE_MONNAIE_IDENT.chaine());
  s_.refuser(e,
             "L'opération n'est pas équilibrée : débit " + posted.debit.toFixed(decimals) + ", crédit " +
                 posted.credit.toFixed(decimals) + ", écart " + (posted.debit - posted.credit).abs().toFixed(decimals) +
                 ".@La validation est impossible !",
             "");
  return false;
}

// The header holds the sums of its lines and the piece's debit and credit.
void DebitCreditTotals::saving() {
  Sums posted = sums();
  s_.MIRVAE_HT = posted.ht;
  s_.MIRVAE_TVA = posted.tva;
  s_.MIRVAE_TTC = posted.ttc;
  s_.table(false)->affecter("DEBPIS", Valeur::montant(posted.debit));
  s_.table(false)->affecter("CREPIS", Valeur::montant(posted.credit));
}

void DebitCreditTotals::calcul_totaux(Evt*) {
  Decimal debit, credit;
  s_.forEachLine([&](Table& line) {
    debit += line.valeur("MTDEBS").decimal();
    credit += line.valeur("MTCRES").decimal();
  });
  V_TOT_DEB = debit;
  V_TOT_CRE = credit;
  V_SOLDE = debit - credit;
  s_.ecran()->affiche("GRP_TOT", "");
}

}  // namespace entry

using host::Decimal;
using host::Evt;

MIRVAEGestion6::MIRVAEGestion6(Evt* e) : EntryScreen(e, registry::operationKind(6)) {
  registerBranches(entry::branchesWithout(
      entry::kInvoiceBranches, {{"VLIBCP1", "COMPT1_CHOISIR", "LST_VLIBCP2", "COMPT2_CHOISIR"}},
      {"COMPT_CHOISIR", "LST_VLIBCP", "LST_VLIBSENS_DC", "CALCUL_DC", "TYPLB_CHOISIR", "TESTS_VALIDATION",
       "EXTRACTION_TABLE_MIRVAJUS", "SUPPRESSION_TABLE_MIRVAJUS", "VALIDATION_TABLE_MIRVAJUS"}));
}

void MIRVAEGestion6::provide(entry::Handlers& handlers) {
  EntryScreen::provide(handlers);
  handlers.add("LST_VLIBSENS_DC", this, &MIRVAEGestion6::lst_vlibsens_dc);
  handlers.add("CALCUL_DC", this, &MIRVAEGestion6::calcul_dc);
}

void MIRVAEGestion6::completeModelLine(host::Table& model) {
  if (!model.valeur("COL_MTDEB").decimal().isZero())
    MIRVAL_SENS_DC = "D";
  else if (!model.valeur("COL_MTCRE").decimal().isZero())
    MIRVAL_SENS_DC = "C";
}

void MIRVAEGestion6::selection(Evt* e) {
  EntryScreen::selection(e);
  lineAccount_.VLIBSENS_DC = entry::senseLabel(MIRVAL_SENS_DC);
}

void MIRVAEGestion6::debut_creation_ligne(Evt* e) {
  EntryScreen::debut_creation_ligne(e);
  lineAccount_.VLIBSENS_DC = "";
  lineAccount_.VLIBNATUC = entry::kAnyNature;
}

// The amount of a VAT account is typed as VAT: it is the whole line.
void MIRVAEGestion6::lst_mirval_tva(Evt* e) {
  if (!lineAccount_.vatAccount()) return EntryScreen::lst_mirval_tva(e);
  MIRVAL_HT = 0;
  MIRVAL_TTC = MIRVAL_TVA;
  procedure("CALCUL_DC");
  afficherLigne();
}

// The side typed as "D"/"Débit" or "C"/"Crédit".
void MIRVAEGestion6::lst_vlibsens_dc(Evt* e) {
  std::string typed = lineAccount_.VLIBSENS_DC.chaine();
  char sense = typed.empty() ? 0 : static_cast<char>(std::toupper(static_cast<unsigned char>(typed[0])));
  if (sense != 'D' && sense != 'C' && !typed.empty())
    return refuser(e, "Le sens doit être D (débit) ou C (crédit) !", "LST_VLIBSENS_DC");
  MIRVAL_SENS_DC = sense ? std::string(1, sense) : std::string();
  lineAccount_.VLIBSENS_DC = entry::senseLabel(MIRVAL_SENS_DC);
  procedure("CALCUL_DC");
  afficherLigne();
}

void MIRVAEGestion6::calcul_dc(Evt*) {
  Decimal amount = lineAccount_.vatAccount() ? MIRVAL_TVA.decimal() : MIRVAL_TTC.decimal();
  bool debit = MIRVAL_SENS_DC == "D", credit = MIRVAL_SENS_DC == "C";
  MIRVAL_MTDEBS = debit ? amount : Decimal();
  MIRVAL_MTCRES = credit ? amount : Decimal();
}

void MIRVAEGestion6::validation_ligne(Evt* e) {
  bool vat = !MIRVAL_NUMCP.estVide() && lireOuVider(COMPT, COMPT_NUMCP, MIRVAL_NUMCP) &&
             lineAccount_.vatAccount();
  if (MIRVAL_NUMCP.estVide())
    return refuser(e, "La saisie d'un compte " + lineAccount_.VLIBNATUC.chaine() + " est obligatoire !", "LST_VLIBCP");
  if (MIRVAL_NUMCP.chaine().ends_with('*')) return refuser(e, "Vous devez choisir un n° de compte", "LST_VLIBCP");
  if (vat && MIRVAL_TVA == 0) return refuser(e, "La saisie d'un montant TVA est obligatoire !", "LST_MIRVAL.TVA");
  // A VAT account has no amount excluding tax and no VAT code of its own.
  if (!vat && V_HT == 0)
    return refuser(e, "La saisie d'un montant " + V_SAISIE_MTT.chaine() + " est obligatoire !", "LST_V_HT");
  if (!vat && !(MIRVAL_TVA == 0) && MIRVAL_COTVA.estVide())
    return refuser(e, "La saisie d'un code TVA est obligatoire !", "LST_MIRVAL.COTVA");
  if (MIRVAL_SENS_DC.estVide()) return refuser(e, "La saisie d'un sens D/C est obligatoire !", "LST_MIRVAL.SENS_DC");
  // The posted amounts follow the amounts, whichever was typed last.
  procedure("CALCUL_DC");
  if (MIRVAL_IDENT.estVide()) nouvelIdentifiant("MIRVAL", MIRVAL_IDENT);
  Sdocum::validation_ligne(e);
}
