#include "justification/gest_jus.h"

#include <algorithm>
#include <iterator>
#include <optional>

#include "host/currency.h"
#include "host/error.h"
#include "host/session.h"
#include "model/shown.h"

namespace justification {

using host::Decimal;
using host::Evt;
using host::EvtParamRef;
using host::EvtParamVal;
using host::Valeur;

namespace {

constexpr const char* kExchangeColumn = "LST_MIRVAJUS_M02.MTECHG";

// One row of the decision on the journal and account types: the side tested first,
// then the other, each with its heading and, for a cancelling movement, its label and
// the step that names a failed deletion.
struct SideRule {
  bool debit;
  const char* heading;
  const char* cancelLabel;  // nullptr: a settlement to justify
  const char* step;
};
struct JournalAccountRule {
  const char* journalAccount;
  SideRule first;
  std::optional<SideRule> second;
};

const JournalAccountRule kJournalAccountRules[] = {
    {"TT", {.debit = true, .heading = "Décaissement", .cancelLabel = nullptr, .step = ""},
     SideRule{.debit = false, .heading = "Encaissement", .cancelLabel = nullptr, .step = ""}},
    {"TR",
     {.debit = true, .heading = "Annulation encaissement effet à recevoir", .cancelLabel = "01581", .step = "1"},
     SideRule{.debit = false, .heading = "Encaissement Effet à recevoir", .cancelLabel = nullptr, .step = ""}},
    {"TS", {.debit = false, .heading = "Annulation règlement effet à payer", .cancelLabel = "01584", .step = "2"},
     SideRule{.debit = true, .heading = "Règlement effet à payer", .cancelLabel = nullptr, .step = ""}},
    {"CT", {.debit = true, .heading = "Annulation Effet à recevoir", .cancelLabel = "01582", .step = "3"},
     SideRule{.debit = false, .heading = "Réception Effet à recevoir", .cancelLabel = nullptr, .step = ""}},
    {"CR", {.debit = false, .heading = "Annulation Effet à recevoir", .cancelLabel = nullptr, .step = ""}, {}},
    {"FT", {.debit = false, .heading = "Annulation Effet à payer", .cancelLabel = "01583", .step = "4"},
     SideRule{.debit = true, .heading = "Emission Effet à payer", .cancelLabel = nullptr, .step = ""}},
    {"FS", {.debit = true, .heading = "Annulation Effet à payer", .cancelLabel = nullptr, .step = ""}, {}},
};

// Which movements of the account a settlement may settle, by journal and account
// types: the side the settlement must have, and the movement's.
enum class Need { Any, Debit, Credit };
struct KeptMovement {
  const char* journalAccount;
  Need settlement;
  Need movement;
  bool ownJournalType;  // the movement's journal must be of type `journalType`
  char journalType;     // else: its type must not be "T", "C" or "F"
};
const KeptMovement kKeptMovements[] = {
    {"TT", Need::Any, Need::Any, false, 0},        {"TR", Need::Credit, Need::Debit, true, 'C'},
    {"TS", Need::Debit, Need::Credit, true, 'F'},  {"CT", Need::Credit, Need::Any, false, 0},
    {"CR", Need::Credit, Need::Debit, true, 'C'},  {"FT", Need::Debit, Need::Any, false, 0},
    {"FS", Need::Debit, Need::Credit, true, 'F'},
};

// The columns of the currency decision: the due date's amount handed on (keeping
// currency, else the piece's) and whether an exchange difference applies.
struct CurrencyColumn {
  int column;
  bool keepingAmount;
  bool exchange;
};
constexpr CurrencyColumn kCurrencyColumns[] = {
    {1, true, false},   {4, true, false},   {6, true, false},   {7, false, false},  {8, false, false},
    {12, true, false},  {16, true, false},  {22, true, false},  {24, false, false}, {31, false, true},
    {32, false, true},  {39, true, true},   {40, false, true},  {46, true, true},   {48, false, true},
    {52, true, false},  {56, false, true},  {57, true, false},  {60, true, false},  {62, true, false},
    {63, true, true},   {64, false, true},
};

bool debitSide(const Decimal& debit, const Decimal& credit) { return debit.sign() > 0 || credit.sign() < 0; }
bool creditSide(const Decimal& debit, const Decimal& credit) { return credit.sign() > 0 || debit.sign() < 0; }

bool meets(Need need, bool debit, bool credit) {
  return need == Need::Any || (need == Need::Debit ? debit : credit);
}

}  // namespace

MIRVAEGest_jus::MIRVAEGest_jus(Evt* e) : Traitecr(e) {
  Evt* launch = lancement();
  host::Donnee* params[] = {&V_IDENTR, &V_TYPJL, &V_TYPCPT, &V_NUMCP, &V_MTDEB,  &V_MTCRE,
                            &V_DEBEX,  &P_DTOPE, &P_MONNAIE_RGT, &P_COURS, &P_RETOUR};
  const int count = launch ? std::min<int>(launch->nbParams(), std::size(params)) : 0;
  for (int i = 0; i < count; ++i) launch->param(i, *params[i], params[i] == &P_RETOUR);
  nomBase("CP");
  nomLibelles("LIBE1", "LIBEL");
  nomEcran("GEST_JUS");

  addBranch("DEBUT", [this](Evt* ev) { debut(ev); });
  addBranch("CTRL_ACTUALISER_MODE", &MIRVAEGest_jus::ctrl_actualiser_mode);
  addBranch("LECTURE_ECHEANCES_REGLEES", &MIRVAEGest_jus::lecture_echeances_reglees);
  addBranch("LECTURE_ECHEANCES_A_REGLER", &MIRVAEGest_jus::lecture_echeances_a_regler);
  addBranch("ANALYSE_SITUATION_JUSTIFICATION", &MIRVAEGest_jus::analyse_situation_justification);
  addBranch("CALCUL_ECHEANCE_MONNAIE_RGT_TENUE", &MIRVAEGest_jus::calcul_echeance_monnaie_rgt_tenue);
  addBranch("LST_SELECTION", &MIRVAEGest_jus::lst_selection);
  addBranch("LST_DEBUT_LIGNE", &MIRVAEGest_jus::lst_debut_ligne);
  addBranch("LIRE_LST", &MIRVAEGest_jus::lire_lst);
  addBranch("CTRL_DEBUT_MODIF", [this](Evt* ev) { ctrl_debut_modif(ev); });
  addBranch("ANNULATION_JUSTIFICATION", &MIRVAEGest_jus::annulation_justification);
  addBranch("CALCUL_TOTAL_REGLE", &MIRVAEGest_jus::calcul_total_regle);
  addBranch("LST_MIRVAJUS_M02.MTREGS", &MIRVAEGest_jus::lst_mirvajus_m02_mtregs);
  addBranch("LST_MIRVAJUS_M02.MTREG", &MIRVAEGest_jus::lst_mirvajus_m02_mtreg);
  addBranch("JUSTIFICATION_MONNAIE_OUT", &MIRVAEGest_jus::justification_monnaie_out);
  addBranch("BT_MT_REGLEMENT", &MIRVAEGest_jus::bt_mt_reglement);
  addBranch("BT_SOLDE", &MIRVAEGest_jus::bt_solde);
  addBranch("VALID", &MIRVAEGest_jus::valid);
  addBranch("ABAND", &MIRVAEGest_jus::aband);
}

// ---------------------------------------------------------------------------- helpers

void MIRVAEGest_jus::messageOk(const std::string& text) {
  EvtParamVal message(1, text);
  appelerProcedure("*", "CPMESSAG", "INTERFACE", "MESS_OK", &message, -1);
}

bool MIRVAEGest_jus::question(const std::string& text) {
  V_CHOIX = 0;
  EvtParamRef ask(2, text, &V_CHOIX);
  appelerProcedure("COMPTA", "COMPTA", "MOD_CAL_BIBLIOPROC", "MESS_ON", &ask, -1);
  return V_CHOIX == 1;
}

void MIRVAEGest_jus::leave(Evt* e) {
  host::Message::nettoie(this);
  sortir(e, 0);
}

void MIRVAEGest_jus::tableError(const char* step, int failure) {
  host::Chaine automaton(code());
  host::Chaine stepText(step);
  host::Entier error(failure);
  EvtParamRef params(3, &automaton, &stepText, &error);
  appelerProcedure("", "MIRVAE", "MOD_CAL_BIBLIOPROC", "ERREUR_TABLE", &params, -1);
}

void MIRVAEGest_jus::selectLineRows(host::Table& rows, host::Champ& identr) {
  rows.initRequete();
  rows.ajouteFiltre(identr, '=', V_IDENTR);
  rows.activeRequete();
}

void MIRVAEGest_jus::deleteLineRows(const char*) {
  selectLineRows(MIRVAJUS_M01, M01_IDENTR);
  MIRVAJUS_M01.vide();
  MIRVAJUS_M01.initRequete();
}

Decimal MIRVAEGest_jus::round(const Decimal& amount, const std::string& currency) const {
  return host::euro().arrondir(amount, currency.empty() ? host::euro().tenue() : currency);
}

Decimal MIRVAEGest_jus::convert(const Decimal& amount, const std::string& from, const std::string& to,
                                bool atPieceRate) const {
  if (from == to) return round(amount, to);
  host::Devises& devises = host::euro();
  const host::Jour day = atPieceRate ? V_DATE_PIECE.jour() : V_DATE_COURS.jour();
  auto rate = [&](const std::string& currency) {
    const Decimal given = atPieceRate ? V_COURS_PIECE.decimal() : P_COURS.decimal();
    const std::string& owner = atPieceRate ? V_MONNAIE_PIECE.chaine() : V_MONNAIE_RGT.chaine();
    if (currency == owner && !devises.estCoursFixe(currency) && given.sign() > 0) return given;
    return devises.cours(currency, day);
  };
  return devises.reprice(amount, rate(from), rate(to), to);
}

void MIRVAEGest_jus::loadFigures() {
  const std::string keeping = PARAM_MONNAIE_IDENT.chaine();
  V_MTECH = round(ECHEA_MTECH.decimal(), keeping);
  V_EEUR = round(ECHEA_ECART.decimal(), keeping);
  V_MONNAIE_PIECE = PIECE_MONNAIE_IDENT.chaine().empty() ? keeping : PIECE_MONNAIE_IDENT.chaine();
  V_COURS_PIECE = PIECE_COURS;
  V_DATE_PIECE = PIECE_DTPIE;
}

Decimal MIRVAEGest_jus::netOfPiece() {
  const Decimal debit = MOUVE_MTDEB.decimal(), credit = MOUVE_MTCRE.decimal();
  if (V_TYPE_MT_A_JUSTIF == "C") return debit.isZero() ? -credit : debit;
  return credit.isZero() ? -debit : credit;
}

Decimal MIRVAEGest_jus::shownDueAmount(host::Champ& amount) {
  const Decimal value = amount.decimal().abs();
  return netOfPiece().sign() < 0 ? -value : value;
}

void MIRVAEGest_jus::recomputeRemainder() {
  V_RESTE_A_JUSTIF = round(V_MT_A_JUSTIF.decimal() - V_TOTAL_REGT.decimal(), V_MONNAIE_RGT.chaine());
  ecran()->affiche("V_RESTE_A_JUSTIF", "V_TOTAL_REGT", "PIED_1", "PIED_2", "");
}

void MIRVAEGest_jus::writeRow(const char* step) {
  try {
    MIRVAJUS_M02.ecrit();
  } catch (const host::HostError&) {
    tableError(step, 1);
  }
}

// ---------------------------------------------------------------------------- start

void MIRVAEGest_jus::debut(Evt* e) {
  P_RETOUR = "ABANDON";
  if (PARAM.lit(3, PARAM_PNUME, '=', Valeur::entier(1)) != 0) {
    messageOk(libelle("0028"));
    return leave(e);
  }
  V_MONNAIE_RGT = P_MONNAIE_RGT.chaine().empty() ? PARAM_MONNAIE_IDENT.chaine() : P_MONNAIE_RGT.chaine();
  V_MONNAIE_TENUE = PARAM_MONNAIE_IDENT;
  V_DATE_COURS = P_DTOPE;
  host::euro().definirCourante(V_MONNAIE_RGT.chaine(), P_DTOPE.jour(), P_COURS.decimal());

  if (V_TYPJL == "R") V_TYPJL = "T";
  V_JOURNAL_COMPTE = V_TYPJL.chaine() + V_TYPCPT.chaine();
  const Decimal debit = V_MTDEB.decimal(), credit = V_MTCRE.decimal();
  for (const JournalAccountRule& rule : kJournalAccountRules) {
    if (V_JOURNAL_COMPTE != rule.journalAccount) continue;
    const SideRule* applied = nullptr;
    for (const SideRule* side : {&rule.first, rule.second ? &*rule.second : nullptr})
      if (!applied && side && (side->debit ? debitSide(debit, credit) : creditSide(debit, credit))) applied = side;
    if (!applied) {
      LIB_DEC_ENC = "";
      V_TYPE_MT_A_JUSTIF = "";
      break;
    }
    LIB_DEC_ENC = applied->heading;
    V_TYPE_MT_A_JUSTIF = applied->debit ? "D" : "C";
    V_MT_A_JUSTIF = applied->debit ? debit - credit : credit - debit;
    if (applied->cancelLabel) {
      // A cancelling movement justifies nothing.
      deleteLineRows(applied->step);
      messageOk(libelle(applied->cancelLabel));
      return leave(e);
    }
    break;
  }

  MIRVAJUS_M02.initRequete();
  MIRVAJUS_M02.vide();
  selectLineRows(MIRVAJUS_M01, M01_IDENTR);
  const bool justified = MIRVAJUS_M01.nombre() > 0;
  MIRVAJUS_M01.initRequete();
  V_REGT_JUSTIF = justified ? "O" : "N";
  if (justified) appelerProcedure("", "", "", "LECTURE_ECHEANCES_REGLEES", nullptr, 0);

  host::Entier found(0);
  EvtParamRef flag(1, &found);
  appelerProcedure("", "", "", "LECTURE_ECHEANCES_A_REGLER", &flag, 0);
  if (found == 0 && V_REGT_JUSTIF == "N") {
    messageOk(libelle("0158"));
    return leave(e);
  }
  appelerProcedure("", "", "", "CALCUL_TOTAL_REGLE", nullptr, 0);
  recomputeRemainder();
  // The list opens on its first row.
  if (!rows().empty()) goToRow(1);
}

void MIRVAEGest_jus::ctrl_actualiser_mode(Evt* e) {
  host::Chaine mode("PMODE", "", "", 4, this);
  host::Date date("PDATE", "", "", 4, this);
  host::Double rate("PCOURS", "", "", 4, this);
  if (e && e->nbParams() > 2) {
    e->param(0, mode, 0);
    e->param(1, date, 0);
    e->param(2, rate, 0);
  }
  // The amounts of the list are in the settlement currency: it may not change here.
  erreurMethode(1, e);
}

// ---------------------------------------------------------------------------- the due dates

void MIRVAEGest_jus::lecture_echeances_reglees(Evt*) {
  selectLineRows(MIRVAJUS_M01, M01_IDENTR);
  for (int rc = MIRVAJUS_M01.suivant(3); rc == 0; rc = MIRVAJUS_M01.suivant(1)) {
    MIRVAJUS_M02.raz();
    M02_NUSYS = M01_NUSYS;
    M02_MTREG = M01_MTREG;
    M02_MTREGS = M01_MTREGS;
    M02_MTEEUR = M01_MTEEUR;
    M02_MTECHG = M01_MTECHG;
    if (ECHEA.lit(3, ECHEA_NUSYS, '=', M01_NUSYS) != 0) {
      tableError("5", 1);
      continue;
    }
    M02_UNIQ = ECHEA_UNIQ;
    M02_DTECH = ECHEA_DTECH;
    if (MOUVE.lit(3, MOUVE_UNIQ, '=', ECHEA_UNIQ) != 0) {
      tableError("6", 1);
      continue;
    }
    M02_DTOPE = MOUVE_DTOPE;
    M02_NPIES = MOUVE_NLIGS.chaine().substr(0, 11);
    if (PIECE.lit(3, PIECE_NPIES, '=', M02_NPIES) != 0) {
      tableError("7", 1);
      continue;
    }
    M02_NPIEC = PIECE_NPIEC;
    loadFigures();
    appelerProcedure("", "", "", "ANALYSE_SITUATION_JUSTIFICATION", nullptr, 0);
    // The row keeps the sign of its piece against the settlement.
    MSK_MTPIE = netOfPiece();
    const Decimal reg = M02_MTREG.decimal(), regs = M02_MTREGS.decimal();
    if ((MSK_MTPIE.decimal().sign() < 0 && reg.sign() > 0) || (MSK_MTPIE.decimal().sign() > 0 && reg.sign() < 0)) {
      M02_MTREG = -reg;
      M02_MTREGS = -regs;
    }
    exchangeDifference();
    writeRow("8");
  }
  MIRVAJUS_M01.initRequete();
}

void MIRVAEGest_jus::lecture_echeances_a_regler(Evt* e) {
  host::Donnee& found = e->parametre(0);
  found = 0;
  const Decimal debit = V_MTDEB.decimal(), credit = V_MTCRE.decimal();
  const KeptMovement* rule = nullptr;
  for (const KeptMovement& k : kKeptMovements)
    if (V_JOURNAL_COMPTE == k.journalAccount) rule = &k;
  if (!rule || !meets(rule->settlement, debitSide(debit, credit), creditSide(debit, credit))) return;

  // The account's movements from the start of the exercise, not lettered.
  MOUVE.initRequete();
  MOUVE.ajouteFiltre(MOUVE_INDX2, '+', V_NUMCP.chaine() + "|" + host::jourIso(V_DEBEX.jour()));
  MOUVE.ajouteFiltre(MOUVE_INDX2, '-', V_NUMCP.chaine() + "|2999-01-01");
  MOUVE.ajouteFiltre(MOUVE_RELET, '=', "");
  MOUVE.choisitIndex("INDX2");
  MOUVE.activeRequete();
  for (int rc = MOUVE.suivant(3); rc == 0; rc = MOUVE.suivant(1)) {
    if (JONAL.lit(3, JONAL_NUMJL, '=', MOUVE_NUMJL) != 0) {
      tableError("9", 1);
      continue;
    }
    if (JONAL_TYPJL == "R" && JONAL.lit(3, JONAL_NUMJL, '=', MOUVE_JLNOR) != 0) {
      tableError("10", 1);
      continue;
    }
    const std::string type = JONAL_TYPJL.chaine();
    const bool ownType = rule->ownJournalType ? type == std::string(1, rule->journalType)
                                              : type != "T" && type != "C" && type != "F";
    const Decimal mdebit = MOUVE_MTDEB.decimal(), mcredit = MOUVE_MTCRE.decimal();
    if (!ownType || !meets(rule->movement, debitSide(mdebit, mcredit), creditSide(mdebit, mcredit))) continue;

    ECHEA.initRequete();
    ECHEA.ajouteFiltre(ECHEA_UNIQ, '=', MOUVE_UNIQ);
    ECHEA.activeRequete();
    for (int d = ECHEA.suivant(3); d == 0; d = ECHEA.suivant(1)) {
      if (!(ECHEA_UNIQR == 0)) continue;
      // A due date this line or another line of the operation justifies already.
      if (MIRVAJUS_M01A.lit(3, M01A_NUSYS, '=', ECHEA_NUSYS) == 0) continue;
      found = 1;
      MIRVAJUS_M02.raz();
      M02_NUSYS = ECHEA_NUSYS;
      M02_UNIQ = ECHEA_UNIQ;
      M02_DTECH = ECHEA_DTECH;
      M02_MTREG = Decimal();
      if (MOUVE2.lit(3, MOUVE2_UNIQ, '=', ECHEA_UNIQ) != 0) {
        tableError("11", 1);
        continue;
      }
      M02_DTOPE = MOUVE2_DTOPE;
      M02_NPIES = MOUVE2_NLIGS.chaine().substr(0, 11);
      if (PIECE.lit(3, PIECE_NPIES, '=', M02_NPIES) != 0) {
        tableError("12", 1);
        continue;
      }
      M02_NPIEC = PIECE_NPIEC;
      loadFigures();
      appelerProcedure("", "", "", "ANALYSE_SITUATION_JUSTIFICATION", nullptr, 0);
      writeRow("13");
    }
    ECHEA.initRequete();
  }
  ECHEA.initRequete();
  MOUVE.initRequete();
}

void MIRVAEGest_jus::analyse_situation_justification(Evt*) {
  host::Devises& devises = host::euro();
  const std::string keeping = V_MONNAIE_TENUE.chaine(), piece = V_MONNAIE_PIECE.chaine(),
                    settlement = V_MONNAIE_RGT.chaine();
  const int out = 4 * !devises.estZoneEuro(keeping) + 2 * !devises.estZoneEuro(piece) + !devises.estZoneEuro(settlement);
  const int equal = 1 + 4 * (keeping != piece) + 2 * (keeping != settlement) + (piece != settlement);
  V_FLAG_COL = 8 * out + equal;
  for (const CurrencyColumn& c : kCurrencyColumns) {
    if (!(V_FLAG_COL == c.column)) continue;
    host::Monnaie P_MTECH("P_MTECH", "Montant échéance selon résultat table de décision", "", 4, this);
    host::Chaine V_FLAG_CHANGE("V_FLAG_CHANGE", "Témoin de gestion gain ou perte de change", "", 4, this);
    host::Chaine from("P_MONNAIE", "", "", 4, this);
    P_MTECH = (c.keepingAmount ? ECHEA_MTECH : ECHEA_MTECHS).decimal().abs();
    from = c.keepingAmount ? keeping : piece;
    V_FLAG_CHANGE = c.exchange ? "OUI" : "NON";
    EvtParamRef params(3, &P_MTECH, &V_FLAG_CHANGE, &from);
    appelerProcedure("", "", "", "CALCUL_ECHEANCE_MONNAIE_RGT_TENUE", &params, 0);
    return;
  }
}

void MIRVAEGest_jus::calcul_echeance_monnaie_rgt_tenue(Evt* e) {
  const Decimal amount = e->parametre(0).decimal();
  const std::string flag = e->parametre(1).chaine();
  const std::string from = e->nbParams() > 2 ? e->parametre(2).chaine() : V_MONNAIE_TENUE.chaine();
  // A due date settled in its own currency is valued at its piece's rate.
  V_MTECHS = convert(amount, from, V_MONNAIE_RGT.chaine(), V_MONNAIE_PIECE == V_MONNAIE_RGT);
  if (flag == "NON") {
    ecran()->interdit(kExchangeColumn, "");
    M02_FLAG_CHG = "N";
  } else {
    ecran()->autorise(kExchangeColumn, "");
    M02_FLAG_CHG = "O";
  }
}

// ---------------------------------------------------------------------------- the list

std::vector<model::RowText> MIRVAEGest_jus::rows() {
  std::vector<model::RowText> out;
  model::AmountDecimals decimals;
  MIRVAJUS_M02A.initRequete();
  MIRVAJUS_M02A.choisitIndex("INDX1");
  MIRVAJUS_M02A.activeRequete();
  for (int rc = MIRVAJUS_M02A.suivant(3); rc == 0; rc = MIRVAJUS_M02A.suivant(1)) {
    model::RowText row;
    for (const host::Colonne& c : MIRVAJUS_M02A.colonnes()) {
      std::string text = model::shownText(MIRVAJUS_M02A.valeur(c.name), *this, decimals);
      row["MIRVAJUS_M02." + c.name] = text;
      row[c.name] = text;
    }
    out.push_back(std::move(row));
  }
  MIRVAJUS_M02A.initRequete();
  return out;
}

bool MIRVAEGest_jus::goToRow(int n) {
  MIRVAJUS_M02.initRequete();
  MIRVAJUS_M02.choisitIndex("INDX1");
  MIRVAJUS_M02.activeRequete();
  int rc = MIRVAJUS_M02.suivant(3);
  for (int i = 1; rc == 0 && i < n; ++i) rc = MIRVAJUS_M02.suivant(1);
  if (rc != 0) return false;
  appelerProcedure("", "", "", "LST_DEBUT_LIGNE", nullptr, 0);
  return erreurMethode() == 0;
}

void MIRVAEGest_jus::lst_selection(Evt*) {
  appelerProcedure("", "", "", "LIRE_LST", nullptr, 0);
  ecran()->affiche("LST_TBL_MOUVE", "LST_TBL_PIECE", "LST_TBL_JONAL", "LST_TBL_ECHEA", "PIED_1", "PIED_2", "");
}

void MIRVAEGest_jus::lst_debut_ligne(Evt* e) {
  appelerProcedure("", "", "", "LIRE_LST", nullptr, 0);
  ecran()->affiche("TBL_MOUVE", "TBL_PIECE", "TBL_JONAL", "TBL_ECHEA", "PIED_1", "PIED_2", "");
  erreurMethode(0, e);
}

void MIRVAEGest_jus::lire_lst(Evt*) {
  if (ECHEA.lit(3, ECHEA_NUSYS, '=', M02_NUSYS) != 0) ECHEA.raz();
  if (MOUVE.lit(3, MOUVE_UNIQ, '=', M02_UNIQ) != 0) MOUVE.raz();
  if (PIECE.lit(3, PIECE_NPIES, '=', M02_NPIES) != 0) PIECE.raz();
  if (JONAL.lit(3, JONAL_NUMJL, '=', PIECE_NUMJL) != 0) JONAL.raz();
  // The row's own due date is the one the column handlers compare against.
  loadFigures();
  analyse_situation_justification(nullptr);
  MSK_MTPIE = netOfPiece();
  for (host::Champ* amount : {&ECHEA_MTECH, &ECHEA_MTECHS, &ECHEA_ECART}) *amount = shownDueAmount(*amount);
}

// ---------------------------------------------------------------------------- modification

void MIRVAEGest_jus::ctrl_debut_modif(Evt* e) {
  if (V_REGT_JUSTIF == "O") {
    if (!question(libelle("0167"))) return erreurMethode(1, e);
    Traitecr::ctrl_debut_modif(e);
    appelerProcedure("", "", "", "ANNULATION_JUSTIFICATION", nullptr, 0);
    V_REGT_JUSTIF = "N";
    appelerProcedure("", "", "", "CALCUL_TOTAL_REGLE", nullptr, 0);
    recomputeRemainder();
    // The row in front is read again as the cancellation left it.
    if (MIRVAJUS_M02.lit(3, M02_NUSYS, '=', M02_NUSYS) == 0) appelerProcedure("", "", "", "LIRE_LST", nullptr, 0);
  } else {
    Traitecr::ctrl_debut_modif(e);
  }
  V_FLAG_MODIF = "O";
  erreurMethode(0, e);
}

void MIRVAEGest_jus::annulation_justification(Evt*) {
  MIRVAJUS_M02A.initRequete();
  MIRVAJUS_M02A.activeRequete();
  host::Champ reg("MTREG", &MIRVAJUS_M02A), eeur("MTEEUR", &MIRVAJUS_M02A), echg("MTECHG", &MIRVAJUS_M02A);
  for (int rc = MIRVAJUS_M02A.suivant(3); rc == 0; rc = MIRVAJUS_M02A.suivant(1)) {
    for (host::Champ* amount : {&reg, &M02A_MTREGS, &eeur, &echg}) *amount = Decimal();
    try {
      MIRVAJUS_M02A.ecrit();
    } catch (const host::HostError&) {
      tableError("14", 1);
    }
  }
  MIRVAJUS_M02A.initRequete();
}

void MIRVAEGest_jus::calcul_total_regle(Evt*) {
  Decimal total;
  MIRVAJUS_M02A.initRequete();
  MIRVAJUS_M02A.activeRequete();
  for (int rc = MIRVAJUS_M02A.suivant(3); rc == 0; rc = MIRVAJUS_M02A.suivant(1)) total += M02A_MTREGS.decimal();
  MIRVAJUS_M02A.initRequete();
  V_TOTAL_REGT = round(total, V_MONNAIE_RGT.chaine());
}

// ---------------------------------------------------------------------------- the settled amounts

void MIRVAEGest_jus::lst_mirvajus_m02_mtregs(Evt* e) {
  M02_MTREG = convert(M02_MTREGS.decimal(), V_MONNAIE_RGT.chaine(), V_MONNAIE_TENUE.chaine(), false);
  appelerProcedure("", "", "", "LST_MIRVAJUS_M02.MTREG", nullptr, 0);
  erreurMethode(erreurMethode(), e);
}

void MIRVAEGest_jus::lst_mirvajus_m02_mtreg(Evt* e) {
  const std::string keeping = V_MONNAIE_TENUE.chaine(), settlement = V_MONNAIE_RGT.chaine();
  eeech_ = convert(ECHEA_ECART.decimal(), keeping, settlement, false).abs();
  const Decimal settled = round(M02_MTREGS.decimal(), settlement).abs();
  const Decimal settledKeeping = round(M02_MTREG.decimal(), keeping).abs();
  const Decimal due = V_MTECHS.decimal().abs(), dueKeeping = V_MTECH.decimal().abs();

  // More than the due date asks for, its conversion difference included, is refused.
  if (settled > due + eeech_) {
    messageOk("Le montant réglé dépasse le montant de l'échéance.");
    controler("LST_MIRVAJUS_M02.MTREGS", "");
    rejeter(e);
    return erreurMethode(1, e);
  }

  const int sign = shownDueAmount(ECHEA_MTECHS).sign() < 0 ? -1 : 1;
  if (host::euro().estZoneEuro(settlement)) {
    const bool fullKeeping = settledKeeping == dueKeeping;
    const bool conversionOnly = !eeech_.isZero() && !V_EEUR.decimal().isZero() && settled - due == eeech_;
    const bool fullSettlement = settled == due || conversionOnly;
    const Decimal ecart = ECHEA_ECART.decimal().abs();
    if (fullSettlement) {
      const Decimal base = V_EEUR.decimal().isZero() ? Decimal() : ecart;
      M02_MTEEUR = (fullKeeping ? base : dueKeeping - settledKeeping + base) * Decimal(sign);
    }
  } else {
    host::Monnaie P_EEECH("P_EEECH", "", "", 4, this), P_MTRGTS("P_MTRGTS", "", "", 4, this),
        P_MTRGT("P_MTRGT", "", "", 4, this);
    P_EEECH = eeech_;
    P_MTRGTS = settled;
    P_MTRGT = settledKeeping;
    EvtParamRef params(3, &P_EEECH, &P_MTRGTS, &P_MTRGT);
    appelerProcedure("", "", "", "JUSTIFICATION_MONNAIE_OUT", &params, 0);
  }

  // The settled amounts carry the due date's sign.
  const Decimal regs = M02_MTREGS.decimal(), reg = M02_MTREG.decimal();
  if ((sign < 0 && regs.sign() > 0) || (sign > 0 && regs.sign() < 0)) {
    M02_MTREGS = -regs;
    M02_MTREG = -reg;
  }
  exchangeDifference();
  writeRow("15");
  ecran()->affiche("LST", "PIED_2", "");
  appelerProcedure("", "", "", "CALCUL_TOTAL_REGLE", nullptr, 0);
  recomputeRemainder();
  erreurMethode(0, e);
}

void MIRVAEGest_jus::exchangeDifference() {
  if (M02_FLAG_CHG != "O") return;
  const std::string keeping = V_MONNAIE_TENUE.chaine(), settlement = V_MONNAIE_RGT.chaine();
  V_MT_SAISIE = round(M02_MTREGS.decimal(), settlement);
  V_MTRGT_DTRGT = convert(V_MT_SAISIE.decimal(), settlement, keeping, false);
  // The same amount as the piece valued it: at the piece's rate.
  V_MTRGT_COURS_PIECE = convert(V_MT_SAISIE.decimal(), settlement, keeping, true);
  M02_MTECHG = V_MTRGT_COURS_PIECE.decimal() - V_MTRGT_DTRGT.decimal();
}

void MIRVAEGest_jus::justification_monnaie_out(Evt* e) {
  if (!(V_FLAG_COL == 12)) return;
  const Decimal settled = e->parametre(1).decimal().abs(), settledKeeping = e->parametre(2).decimal().abs();
  if (settled != V_MTECHS.decimal().abs()) return;
  const Decimal ecart = ECHEA_ECART.decimal().abs();
  const int sign = shownDueAmount(ECHEA_MTECHS).sign() < 0 ? -1 : 1;
  const Decimal dueKeeping = V_MTECH.decimal().abs();
  M02_MTEEUR = (settledKeeping == dueKeeping ? ecart : dueKeeping - settledKeeping + ecart) * Decimal(sign);
}

// ---------------------------------------------------------------------------- buttons

void MIRVAEGest_jus::bt_mt_reglement(Evt* e) {
  V_RESTE_A_JUSTIF = V_RESTE_A_JUSTIF.decimal() + M02_MTREGS.decimal();
  const Decimal rest = round(V_RESTE_A_JUSTIF.decimal(), V_MONNAIE_RGT.chaine());
  if (V_MTECHS.decimal().abs() > rest) {
    V_RESTE_A_JUSTIF = V_RESTE_A_JUSTIF.decimal() - M02_MTREGS.decimal();
    messageOk(libelle("01593"));
    return erreurMethode(1, e);
  }
  M02_MTREGS = round(V_MTECHS.decimal().abs(), V_MONNAIE_RGT.chaine());
  ecran()->affiche("LST", "");
  appelerProcedure("", "", "", "LST_MIRVAJUS_M02.MTREGS", nullptr, 0);
}

void MIRVAEGest_jus::bt_solde(Evt* e) {
  if (V_RESTE_A_JUSTIF.decimal() > ECHEA_MTECHS.decimal().abs()) {
    messageOk(libelle("01594"));
    return erreurMethode(1, e);
  }
  M02_MTREGS = V_RESTE_A_JUSTIF.decimal();
  ecran()->affiche("LST", "");
  appelerProcedure("", "", "", "LST_MIRVAJUS_M02.MTREGS", nullptr, 0);
}

// ---------------------------------------------------------------------------- end

void MIRVAEGest_jus::valid(Evt* e) {
  if (V_FLAG_MODIF != "O" && !V_RESTE_A_JUSTIF.decimal().isZero()) {
    // A first validation puts what remains on the current row and stays.
    if (M02_NUSYS == 0) return erreurMethode(1, e);
    M02_MTREGS = V_RESTE_A_JUSTIF.decimal();
    appelerProcedure("", "", "", "LST_MIRVAJUS_M02.MTREGS", nullptr, 0);
    ecran()->affiche("LST", "");
    appelerProcedure("", "", "", "CALCUL_TOTAL_REGLE", nullptr, 0);
    recomputeRemainder();
    host::Chaine control("VALID");
    EvtParamRef about(1, &control);
    appelerProcedure("", "", "", "CTRL_DEBUT_MODIF", &about, 0);
    return erreurMethode(0, e);
  }
  if (!V_RESTE_A_JUSTIF.decimal().isZero() && !V_TOTAL_REGT.decimal().isZero()) {
    messageOk(libelle("0159"));
    return erreurMethode(1, e);
  }
  deleteLineRows("17");
  MIRVAJUS_M02A.initRequete();
  MIRVAJUS_M02A.choisitIndex("INDX1");
  MIRVAJUS_M02A.activeRequete();
  host::Champ nusys("NUSYS", &MIRVAJUS_M02A), reg("MTREG", &MIRVAJUS_M02A), eeur("MTEEUR", &MIRVAJUS_M02A),
      echg("MTECHG", &MIRVAJUS_M02A);
  for (int rc = MIRVAJUS_M02A.suivant(3); rc == 0; rc = MIRVAJUS_M02A.suivant(1)) {
    if (reg.decimal().isZero()) continue;
    MIRVAJUS_M01.raz();
    M01_IDENTR = V_IDENTR;
    M01_NUSYS = nusys;
    M01_MTREG = reg;
    M01_MTREGS = M02A_MTREGS;
    M01_MTEEUR = eeur;
    M01_MTECHG = echg;
    MIRVAJUS_M01.ecrit();
  }
  MIRVAJUS_M02A.initRequete();
  P_RETOUR = "VALIDATION";
  sortir(e, 0);
}

void MIRVAEGest_jus::aband(Evt* e) {
  if (V_FLAG_MODIF == "O" && !question(libelle("01592"))) return erreurMethode(1, e);
  sortir(e, 0);
}

}  // namespace justification
