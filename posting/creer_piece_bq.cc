#include "posting/creer_piece_bq.h"

#include <algorithm>
#include <cctype>

#include "host/clock.h"
#include "host/currency.h"
#include "host/error.h"
#include "host/text.h"

MIRVAECreer_piece_bq::MIRVAECreer_piece_bq(host::Evt* e) : MIRVAECreer_piece_bq(e, 4, "CREER_LIGNE_BANQUE") {}

MIRVAECreer_piece_bq::MIRVAECreer_piece_bq(host::Evt* e, int kind, const char* counterpart)
    : PostingProcess(e, registry::operationKind(kind)), counterpart_(counterpart) {
  registerBranches(counterpart);
  addBranch("FAIT_JUSTIFICATION", &MIRVAECreer_piece_bq::fait_justification);
  addBranch("JUSTIFICATION_ECHEANCE", &MIRVAECreer_piece_bq::justification_echeance);
  addBranch("FAIT_IMPORT_PIECE_EAEUR", &MIRVAECreer_piece_bq::fait_import_piece_eaeur);
  addBranch("FAIT_JUSTIFICATION_EAEUR", &MIRVAECreer_piece_bq::fait_justification_eaeur);
}

posting::Side MIRVAECreer_piece_bq::lineSide() {
  return MIRVAE_TYPE_DR == "D" ? posting::Side::Debit : posting::Side::Credit;
}

host::Valeur MIRVAECreer_piece_bq::vatAccount() {
  if (MIRVAE_TYPE_DR == "D") return CDTVA_DETVA.valeur();
  return salesVatAccount(posting::VatBasis::Debits);
}

bool MIRVAECreer_piece_bq::sendCounterpart() {
  lireCompte(MIRVAE_NUMCP);
  procedure(counterpart_);
  if (!importer("DEBUT_LIGNE")) return false;
  if (!importer("FIN_LIGNE")) return false;
  MOUVE_IMM.raz('N');
  return true;
}

void MIRVAECreer_piece_bq::afterPiece() { procedure("FAIT_JUSTIFICATION"); }

namespace {

constexpr const char* kRoundingLabel = "Arrondissage s/ rgt pièce ";
constexpr const char* kExchangeLabel = "Ecart change s/ rgt pièce ";

// A lettering code from a drawn number: three letters or more, "AAA" first. A group
// still open is written in small letters on the movements it already holds.
std::string letteringCode(long long n) {
  std::string code;
  for (long long rest = n; rest > 0 || code.size() < 3; rest /= 26) code.insert(code.begin(), char('A' + rest % 26));
  return code;
}

std::string lower(std::string code) {
  for (char& c : code) c = static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
  return code;
}

// The rate of an amount of a piece: its own rate for a floating currency, the
// dossier's of its day otherwise (units for one euro).
host::Decimal rateOf(const std::string& currency, const host::Donnee& rate, const host::Jour& day) {
  host::Devises& devises = host::euro();
  if (!devises.estCoursFixe(currency) && rate.decimal().sign() > 0) return rate.decimal();
  return devises.cours(currency, day);
}

host::Decimal movementAmount(host::Champ& debit, host::Champ& credit) {
  return (debit.decimal() - credit.decimal()).abs();
}

}  // namespace

void MIRVAECreer_piece_bq::stop(const std::string& text) { throw host::HostError(text); }

void MIRVAECreer_piece_bq::fait_justification(host::Evt*) {
  groups_.clear();
  difference_movements_.clear();
  // The differences of this posting are tagged with its import instance.
  const std::string tag = V_INSTANCE.chaine();
  EAEUR.initRequete();
  EAEUR.ajouteFiltre(EAEUR_NINST, '=', tag);
  EAEUR.vide();
  if (V_NPIES.estVide() || PIECE.lit(3, PIECE_NPIES, '=', V_NPIES) != 0) return;
  MIRVAL.initRequete();
  MIRVAL.ajouteFiltre(MIRVAL_NUMERO, '/', MIRVAE_IDENT.chaine() + "|");
  MIRVAL.choisitIndex("NUMERO");
  MIRVAL.activeRequete();
  for (int rc = MIRVAL.suivant(3); rc == 0; rc = MIRVAL.suivant(1)) {
    if (MIRVAL_HT == 0 || MOUVE.lit(3, MOUVE_UNIQ, '=', MIRVAL_MOUVE_UNIQ) != 0) continue;
    MIRVAJUS.initRequete();
    MIRVAJUS.ajouteFiltre(MIRVAJUS_IDENTR, '=', MIRVAL_IDENT.chaine());
    MIRVAJUS.activeRequete();
    // A line is justified whole or not at all: what its rows settle is what it pays.
    host::Decimal justified;
    line_rows_left_ = 0;
    for (int row = MIRVAJUS.suivant(3); row == 0; row = MIRVAJUS.suivant(1)) {
      justified += MIRVAJUS_MTREGS.decimal();
      ++line_rows_left_;
    }
    if (line_rows_left_ > 0 && justified != MIRVAL_TTC.decimal().abs())
      stop("La ligne " + MIRVAL_NUMCP.chaine() + " de " + host::euro().texte(MIRVAL_TTC.decimal(), MIRVAE_MONNAIE_IDENT.chaine()) +
           " justifie " + host::euro().texte(justified, MIRVAE_MONNAIE_IDENT.chaine()) +
           " d'échéances : justifiez-la à nouveau avant d'enregistrer l'opération.");
    line_remaining_ = movementAmount(MOUVE_MTDEB, MOUVE_MTCRE);
    for (int row = MIRVAJUS.suivant(3); row == 0; row = MIRVAJUS.suivant(1)) procedure("JUSTIFICATION_ECHEANCE");
    MIRVAJUS.initRequete();
  }
  MIRVAL.initRequete();

  EAEUR.initRequete();
  EAEUR.ajouteFiltre(EAEUR_NINST, '=', tag);
  EAEUR.activeRequete();
  if (EAEUR.nombre() > 0) {
    procedure("FAIT_IMPORT_PIECE_EAEUR");
    procedure("FAIT_JUSTIFICATION_EAEUR");
  } else {
    for (const std::string& group : groups_) closeGroupIfSettled(group);
  }
  EAEUR.initRequete();
  EAEUR.ajouteFiltre(EAEUR_NINST, '=', tag);
  EAEUR.vide();
}

host::Decimal MIRVAECreer_piece_bq::lineShare() {
  host::Decimal share = --line_rows_left_ == 0 ? line_remaining_ : MIRVAJUS_MTREG.decimal();
  line_remaining_ -= share;
  return share;
}

void MIRVAECreer_piece_bq::justification_echeance(host::Evt*) {
  const std::string nusys = MIRVAJUS_NUSYS.chaine();
  // The share of the line movement comes first: every row takes its own, even one
  // that settles nothing.
  const host::Decimal share = lineShare();
  const int sign = MIRVAJUS_MTREG.decimal().sign() < 0 ? -1 : 1;
  if (ECHEA.lit(3, ECHEA_NUSYS, '=', MIRVAJUS_NUSYS) != 0)
    stop("L'échéance n° " + nusys + " justifiée sur cette opération n'existe plus dans la comptabilité : "
         "justifiez la ligne à nouveau.");
  if (!(ECHEA_UNIQR == 0))
    stop("L'échéance n° " + nusys + " est déjà réglée : justifiez la ligne à nouveau.");
  if (MOUVE1.lit(3, MOUVE1_UNIQ, '=', ECHEA_UNIQ) != 0)
    stop("Lecture impossible sur < MOUVE1.UNIQ,EgalA,ECHEA.UNIQ > = " + ECHEA_UNIQ.chaine());
  const std::string npies = MOUVE1_NLIGS.chaine().substr(0, 11);
  if (PIECE1.lit(3, PIECE1_NPIES, '=', npies) != 0)
    stop("Lecture impossible sur < PIECE1.NPIES,EgalA,Gauche(MOUVE1.NLIGS,11) > = " + npies);

  host::Devises& devises = host::euro();
  const std::string keeping = PARAM_MONNAIE_IDENT.chaine(), invoice = PIECE1_MONNAIE_IDENT.chaine(),
                    settlement = MIRVAE_MONNAIE_IDENT.chaine();
  // What the due date still asks for; a due date never paid keeps its first amounts.
  const bool untouched = ECHEA_MTRES == 0 && ECHEA_MTRESS == 0 && ECHEA_MTPAY == 0;
  DBL_RESTE_A_PAYER_EN_MONNAIE_TENUE = (untouched ? ECHEA_MTECH : ECHEA_MTRES).decimal().abs();
  DBL_RESTE_A_PAYER_EN_MONNAIE_FACTURE = (untouched ? ECHEA_MTECHS : ECHEA_MTRESS).decimal().abs();
  // Amounts from here on are magnitudes in the due date's own direction: a credit note
  // netted against a payment is settled by a negative row.
  DBL_MT_REGT_EN_MONNAIE_REGT = MIRVAJUS_MTREGS.decimal().abs();
  DBL_MT_REGT_EN_MONNAIE_TENUE = share * host::Decimal(sign);
  const host::Decimal exchange = MIRVAJUS_MTECHG.decimal() * host::Decimal(sign);
  const host::Decimal rounding = MIRVAJUS_MTEEUR.decimal() * host::Decimal(sign);
  host::Decimal valued = DBL_MT_REGT_EN_MONNAIE_TENUE.decimal() + exchange + rounding;
  host::Decimal inInvoice;
  if (settlement == invoice) {
    inInvoice = DBL_MT_REGT_EN_MONNAIE_REGT.decimal();
  } else if (invoice == keeping) {
    inInvoice = valued;
  } else {
    const host::Jour day = PIECE1_DTPIE.jour();
    inInvoice = devises.reprice(valued, devises.cours(keeping, day), rateOf(invoice, PIECE1_COURS, day), invoice);
  }
  if (inInvoice.sign() <= 0) stop("L'échéance n° " + nusys + " ne peut être réglée d'un montant nul ou négatif.");
  const host::Decimal rest = DBL_RESTE_A_PAYER_EN_MONNAIE_FACTURE.decimal();
  const bool full = inInvoice >= rest;
  if (full) {
    // The last open due date of the invoice takes what the invoice movement still has
    // open, to the cent, so that a settled invoice leaves nothing on its account.
    ECHEA2.initRequete();
    ECHEA2.ajouteFiltre(ECHEA2_UNIQ, '=', ECHEA_UNIQ);
    ECHEA2.activeRequete();
    bool last = true;
    host::Decimal paid;
    for (int rc = ECHEA2.suivant(3); rc == 0; rc = ECHEA2.suivant(1)) {
      if (ECHEA2_NUSYS == ECHEA_NUSYS) continue;
      if (ECHEA2_UNIQR == 0) last = false;
      else paid += ECHEA2_MTPAY.decimal();
    }
    ECHEA2.initRequete();
    DBL_MT_ECHEANCE_EN_MONNAIE_TENUE =
        last ? movementAmount(MOUVE1_MTDEB, MOUVE1_MTCRE) - paid : DBL_RESTE_A_PAYER_EN_MONNAIE_TENUE.decimal();
    DBL_MT_ECHEANCE_EN_MONNAIE_FACTURE = rest;
  } else {
    DBL_MT_ECHEANCE_EN_MONNAIE_TENUE = valued;
    DBL_MT_ECHEANCE_EN_MONNAIE_FACTURE = inInvoice;
  }
  const host::Decimal settledKeeping = DBL_MT_ECHEANCE_EN_MONNAIE_TENUE.decimal();
  const host::Decimal left = DBL_RESTE_A_PAYER_EN_MONNAIE_TENUE.decimal() - settledKeeping;
  if (!full && left.sign() <= 0)
    stop("L'échéance n° " + nusys + " serait soldée en euros sans l'être dans sa monnaie : justifiez la ligne à nouveau.");

  const std::string group = settlementGroup();
  const long long settled = ECHEA_NUSYS.entier();
  ECHEA_UNIQR = MOUVE_UNIQ;
  ECHEA_MTPAY = settledKeeping;
  ECHEA_MTPAYS = DBL_MT_ECHEANCE_EN_MONNAIE_FACTURE.decimal();
  ECHEA_MTRES = full ? host::Decimal() : left;
  ECHEA_MTRESS = full ? host::Decimal() : rest - inInvoice;
  ECHEA_RELET = group;
  ECHEA.ecrit();
  if (!full) {
    // The rest stays due on the same movement, which is thus still offered.
    host::Chaine ident("ident", "", "", 4, this);
    host::Entier largeur(8);
    host::EvtParamRef params(6, "CP", "NDOC", "ECHEA", "", &largeur, &ident);
    appelerProcedure("*", "ZEFNDOC", "INTERFACE", "ATTRIBUE_NUMERO", &params, -1);
    appelerProcedure("*", "ZEFNDOC", "INTERFACE", "VALIDE_NUMERO", &params, -1);
    ECHEA2.copier(ECHEA);
    ECHEA.raz();
    ECHEA.copier(ECHEA2);
    ECHEA_NUSYS = host::Valeur::entier(std::stoll(ident.chaine()));
    ECHEA_UNIQR = 0;
    ECHEA_MTECH = left;
    ECHEA_MTECHS = rest - inInvoice;
    ECHEA.affecter("ECART", host::Valeur::montant(host::Decimal()));
    ECHEA_MTPAY = host::Decimal();
    ECHEA_MTPAYS = host::Decimal();
    ECHEA_MTRES = left;
    ECHEA_MTRESS = rest - inInvoice;
    ECHEA_RELET = "";
    ECHEA.ecrit();
  }
  MOUVE_RELET = lower(group);
  MOUVE.ecrit();

  // What the settlement leaves over or short on the tiers account in keeping currency:
  // the exchange difference as the screen valued it, the rest as rounding.
  const host::Decimal difference = settledKeeping - DBL_MT_REGT_EN_MONNAIE_TENUE.decimal();
  const bool invoiceDebit = !(MOUVE1_MTDEB == 0);
  const host::Decimal exchangePart = difference.isZero() ? host::Decimal() : exchange;
  addDifference(PARAM_PJOCHAN.chaine().c_str(), kExchangeLabel, exchangePart, invoiceDebit, settled);
  addDifference(PARAM_PJOEURO.chaine().c_str(), kRoundingLabel, difference - exchangePart, invoiceDebit, settled);
}

// A positive difference is still due on the invoice: the tiers account takes it on
// the side that settles; a negative one was settled beyond it and goes back.
void MIRVAECreer_piece_bq::addDifference(const char* journal, const char* label, const host::Decimal& amount,
                                         bool invoiceDebit, long long nusys) {
  if (amount.isZero()) return;
  const bool tiersDebit = (amount.sign() > 0) != invoiceDebit;
  EAEUR.raz();
  EAEUR_NINST = V_INSTANCE;
  EAEUR_NUMJL = journal;
  EAEUR_NPICPTA = PIECE1_NPIES;
  EAEUR_NUMCP = MOUVE1_NUMCP;
  EAEUR_LIBECR = std::string(label) + PIECE1_NPIEC.chaine();
  EAEUR_MONTANT = amount.abs();
  EAEUR_SENS = tiersDebit ? "D" : "C";
  EAEUR_NUMENG = host::Valeur::entier(nusys);
  EAEUR.ecrit();
}

std::string MIRVAECreer_piece_bq::settlementGroup() {
  std::string group = host::text::upper(MOUVE_RELET.chaine());
  std::vector<std::string> earlier;
  ECHEA2.initRequete();
  ECHEA2.ajouteFiltre(ECHEA2_UNIQ, '=', ECHEA_UNIQ);
  ECHEA2.activeRequete();
  for (int rc = ECHEA2.suivant(3); rc == 0; rc = ECHEA2.suivant(1))
    if (!ECHEA2_RELET.estVide()) earlier.push_back(ECHEA2_RELET.chaine());
  ECHEA2.initRequete();
  for (const std::string& code : earlier) {
    if (code == group) continue;
    if (group.empty()) group = code;
    else renameGroup(code, group);
  }
  if (group.empty()) {
    host::Chaine number("number", "", "", 4, this);
    host::Entier largeur(9);
    host::EvtParamRef params(6, "CP", "NDOC", "LETTRAGE", "", &largeur, &number);
    appelerProcedure("*", "ZEFNDOC", "INTERFACE", "ATTRIBUE_NUMERO", &params, -1);
    appelerProcedure("*", "ZEFNDOC", "INTERFACE", "VALIDE_NUMERO", &params, -1);
    group = letteringCode(std::stoll(number.chaine()) - 1);
  }
  if (std::find(groups_.begin(), groups_.end(), group) == groups_.end()) groups_.push_back(group);
  return group;
}

void MIRVAECreer_piece_bq::renameGroup(const std::string& from, const std::string& to) {
  ECHEA2.initRequete();
  ECHEA2.ajouteFiltre(ECHEA2_RELET, '=', from);
  ECHEA2.activeRequete();
  for (int rc = ECHEA2.suivant(3); rc == 0; rc = ECHEA2.suivant(3)) {
    ECHEA2_RELET = to;
    ECHEA2.ecrit();
  }
  ECHEA2.initRequete();
  for (const std::string& code : {lower(from), from}) {
    MOUVE2.initRequete();
    MOUVE2.ajouteFiltre(MOUVE2_RELET, '=', code);
    MOUVE2.activeRequete();
    for (int rc = MOUVE2.suivant(3); rc == 0; rc = MOUVE2.suivant(3)) {
      MOUVE2_RELET = code == from ? to : lower(to);
      MOUVE2.ecrit();
    }
    MOUVE2.initRequete();
  }
  // The line movement in the buffer may be one of them.
  if (host::text::upper(MOUVE_RELET.chaine()) == from) MOUVE.lit(3, MOUVE_UNIQ, '=', MOUVE_UNIQ);
  groups_.erase(std::remove(groups_.begin(), groups_.end(), from), groups_.end());
}

void MIRVAECreer_piece_bq::closeGroupIfSettled(const std::string& group) {
  // The invoices of the group, and whether each is settled to its last due date.
  std::vector<long long> invoices;
  ECHEA2.initRequete();
  ECHEA2.ajouteFiltre(ECHEA2_RELET, '=', group);
  ECHEA2.activeRequete();
  for (int rc = ECHEA2.suivant(3); rc == 0; rc = ECHEA2.suivant(1))
    if (std::find(invoices.begin(), invoices.end(), ECHEA2_UNIQ.entier()) == invoices.end())
      invoices.push_back(ECHEA2_UNIQ.entier());
  for (long long uniq : invoices) {
    ECHEA2.initRequete();
    ECHEA2.ajouteFiltre(ECHEA2_UNIQ, '=', host::Valeur::entier(uniq));
    ECHEA2.ajouteFiltre(ECHEA2_UNIQR, '=', host::Valeur::entier(0));
    ECHEA2.activeRequete();
    bool open = ECHEA2.nombre() > 0;
    ECHEA2.initRequete();
    if (open) return;
  }
  // Every movement of the group: its settlements in small letters, and the invoices.
  std::vector<long long> members = invoices;
  MOUVE2.initRequete();
  MOUVE2.ajouteFiltre(MOUVE2_RELET, '=', lower(group));
  MOUVE2.activeRequete();
  for (int rc = MOUVE2.suivant(3); rc == 0; rc = MOUVE2.suivant(1)) members.push_back(MOUVE2_UNIQ.entier());
  MOUVE2.initRequete();
  host::Decimal balance;
  for (long long uniq : members) {
    if (MOUVE2.lit(3, MOUVE2_UNIQ, '=', host::Valeur::entier(uniq)) != 0) continue;
    balance += MOUVE2_MTDEB.decimal() - MOUVE2_MTCRE.decimal();
  }
  // Settled invoices that leave a balance are a fault of the settlement itself: the
  // operation is not saved rather than lettered wrong.
  if (!balance.isZero())
    stop("Le lettrage " + group + " ne s'équilibre pas (" + balance.toString(2) +
         ") : le règlement n'est pas enregistré.");
  const host::Valeur today = host::Valeur::date(host::clock::today());
  for (long long uniq : members) {
    if (MOUVE2.lit(3, MOUVE2_UNIQ, '=', host::Valeur::entier(uniq)) != 0) continue;
    MOUVE2_RELET = group;
    MOUVE2_DTLET = today;
    MOUVE2.ecrit();
  }
}

void MIRVAECreer_piece_bq::fait_import_piece_eaeur(host::Evt*) {
  difference_movements_.clear();
  const std::string tag = V_INSTANCE.chaine();
  host::EvtParamRef instance(1, &V_INSTANCE);
  appelerProcedure("*", "CPPIECE", "INTERFACE", "DEBUT_IMPORT", &instance, -1);
  if (erreurMethode() != 0) stop("La connexion à la comptabilité est impossible !");
  auto failed = [&] { stop("Les écarts du règlement n'ont pu être comptabilisés : l'opération n'est pas enregistrée."); };
  // One piece per journal, its rows in the order they were written.
  std::vector<std::string> journals;
  {
    host::Table rows(this, "", "EAEUR", "EAEUR_JOURNALS");
    host::Champ ninst("NINST", &rows), numjl("NUMJL", &rows);
    rows.initRequete();
    rows.ajouteFiltre(ninst, '=', tag);
    rows.activeRequete();
    for (int rc = rows.suivant(3); rc == 0; rc = rows.suivant(1))
      if (std::find(journals.begin(), journals.end(), numjl.chaine()) == journals.end()) journals.push_back(numjl.chaine());
  }
  for (const std::string& journal : journals) {
    PIECE_IMM.raz('N');
    PIECE_IMM.raz();
    PIECE_IMM_NINST = V_INSTANCE;
    PIECE_IMM_NUMJL = journal;
    PIECE_IMM_DTOPE = MIRVAE_DTOPE;
    PIECE_IMM_NPIEC = MIRVAE_NPIEC;
    PIECE_IMM_INPIE = (journal == PARAM_PJOCHAN.chaine() ? "Ecarts de change s/ rgt " : "Ecarts d'arrondi s/ rgt ") +
                      MIRVAE_NPIEC.chaine();
    PIECE_IMM_MONNAIE_IDENT = PARAM_MONNAIE_IDENT;
    PIECE_IMM_COURS = host::Valeur::reel(1);
    PIECE_IMM_CORIG = "*COMPTA*";
    PIECE_IMM.ecrit();
    host::Chaine npies("npies", "", "", 4, this);
    host::EvtParamRef piece(1, &npies);
    if (!importer("DEBUT_PIECE", &piece)) failed();
    EAEUR.initRequete();
    EAEUR.ajouteFiltre(EAEUR_NINST, '=', tag);
    EAEUR.ajouteFiltre(EAEUR_NUMJL, '=', journal);
    EAEUR.activeRequete();
    for (int rc = EAEUR.suivant(3); rc == 0; rc = EAEUR.suivant(1)) {
      const bool exchange = journal == PARAM_PJOCHAN.chaine();
      const bool tiersDebit = EAEUR_SENS == "D";
      // The firm's side is the other one: a debit is a loss, a credit a gain.
      const host::Champ& account = exchange ? (tiersDebit ? PARAM_PCECP : PARAM_PCECC)
                                            : (tiersDebit ? PARAM_PCEEP : PARAM_PCEEC);
      for (int movement = 0; movement < 2; ++movement) {
        MOUVE_IMM.raz('N');
        MOUVE_IMM.raz();
        MOUVE_IMM_NINST = V_INSTANCE;
        const bool debit = movement == 0 ? tiersDebit : !tiersDebit;
        MOUVE_IMM_NUMCP = movement == 0 ? EAEUR_NUMCP.valeur() : account.valeur();
        MOUVE_IMM_LIBEC = EAEUR_LIBECR;
        (debit ? MOUVE_IMM_MTDEB : MOUVE_IMM_MTCRE) = EAEUR_MONTANT.decimal();
        MOUVE_IMM.ecrit();
        host::EvtParamRef uniq(1, &V_MOUVE_UNIQ);
        if (!importer("DEBUT_LIGNE", &uniq) || !importer("FIN_LIGNE")) failed();
        if (movement == 0) difference_movements_.emplace_back(V_MOUVE_UNIQ.entier(), EAEUR_NUMENG.entier());
      }
    }
    EAEUR.initRequete();
    host::Chaine valider("O");
    host::EvtParamRef fin(1, &valider);
    if (!importer("FIN_PIECE", &fin)) failed();
  }
  if (!importer("FIN_IMPORT")) failed();
}

void MIRVAECreer_piece_bq::fait_justification_eaeur(host::Evt*) {
  for (const auto& [uniq, nusys] : difference_movements_) {
    if (ECHEA.lit(3, ECHEA_NUSYS, '=', host::Valeur::entier(nusys)) != 0 ||
        MOUVE2.lit(3, MOUVE2_UNIQ, '=', host::Valeur::entier(uniq)) != 0)
      stop("L'écart de l'échéance n° " + std::to_string(nusys) + " n'a pu être lettré : l'opération n'est pas enregistrée.");
    MOUVE2_RELET = lower(ECHEA_RELET.chaine());
    MOUVE2.ecrit();
  }
  for (const std::string& group : std::vector<std::string>(groups_)) closeGroupIfSettled(group);
}

MIRVAECreer_piece_ca::MIRVAECreer_piece_ca(host::Evt* e) : MIRVAECreer_piece_bq(e, 5, "CREER_LIGNE_CAISSE") {}
