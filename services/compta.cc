#include "services/compta.h"

#include <chrono>

#include "host/clock.h"
#include "host/currency.h"
#include "host/error.h"
#include "host/session.h"
#include "host/text.h"
#include "services/common.h"
#include "services/ledger.h"
#include "services/messages.h"

namespace services {

using namespace host;
using namespace std::chrono;

namespace {

// The option flags in the order "OPTIONS_DOSSIER" hands them out.
constexpr const char* kOptions[] = {"OPT_TVA",    "OPT_TVA1",   "OPT_QTE",    "OPT_QTE1", "OPT_QTE2",
                                    "OPT_ANA",    "OPT_ANA1",   "OPT_ANA2",   "OPT_ECHCLI", "OPT_ECHFOU",
                                    "OPT_ECHAUT", "OPT_ECH",    "OPT_DEVISE", "OPT_REGT"};
constexpr int kOptionCount = sizeof kOptions / sizeof kOptions[0];

// A year-month "YYYYMM" with a real month.
bool isYearMonth(const std::string& text) {
  if (text.size() != 6 || text.find_first_not_of("0123456789") != std::string::npos) return false;
  int month = std::stoi(text.substr(4, 2));
  return month >= 1 && month <= 12;
}

Jour requiredDay(const Donnee& d, const char* what) {
  Jour day = d.jour();
  if (!day) throw HostError(std::string(what) + " non renseignée");
  return day;
}

std::string money(const Decimal& amount, int decimals) { return amount.toFixed(decimals); }

}  // namespace

// ---------------------------------------------------------------------------- procedures

Compta::Compta(Evt* e) : Automate(e) {
  nomBase("CP");
  nomLibelles("LIBE1", "LIBEL");
  addBranch("VERIF_DOSSIER", &Compta::verif_dossier);
  addBranch("CALCUL_DATE_NOUVEL_EX", &Compta::calcul_date_nouvel_ex);
  addBranch("TABLE_ANNEE_MOIS", &Compta::table_annee_mois);
  addBranch("OPTIONS_DOSSIER", &Compta::options_dossier);
  addBranch("LECTURE_HISTO_TXTVA", &Compta::lecture_histo_txtva);
  addBranch("INCREMENTE_NUMERO_PIECE", &Compta::incremente_numero_piece);
  addBranch("PREFIXE_NUMERO_PIECE", &Compta::prefixe_numero_piece);
  addBranch("LIBELLE_NATURE_COMPTE", &Compta::libelle_nature_compte);
  addBranch("CALCUL_CUMULS_COMPTE", &Compta::calcul_cumuls_compte);
  addBranch("MESS_ON", &Compta::mess_on);
  ajouterProceduresPieces(*this);
}

bool Compta::lireParametres() { return PARAM.lit(3, PNUME, '=', Valeur::entier(1)) == 0; }

void Compta::verif_dossier(Evt* e) {
  exigerParametres(e, 1);
  Donnee& flag = e->parametre(0);
  flag = 0;
  if (!lireParametres()) {
    session().montrer(libelle("0028"));
    return;
  }
  Jour start = PARAM.valeur("PDDEX").jour(), end = PARAM.valeur("PDFEX").jour(),
       closing = PARAM.valeur("PDTCL").jour();
  if (!start || !end || !closing || sys_days(*end) < sys_days(*start) || sys_days(*closing) < sys_days(*start)) {
    session().montrer("Les dates de l'exercice du dossier sont incohérentes :@début <" + jourTexte(start) +
                      ">, fin <" + jourTexte(end) + ">, clôture <" + jourTexte(closing) + "> !");
    return;
  }
  flag = 1;
}

void Compta::calcul_date_nouvel_ex(Evt* e) {
  exigerParametres(e, 2);
  Jour end = requiredDay(e->parametre(0), "date de fin d'exercice");
  e->parametre(1) = Valeur::date(year_month_day{sys_days(*end) + days(1)});
}

void Compta::table_annee_mois(Evt* e) {
  exigerParametres(e, 3);
  Jour start = requiredDay(e->parametre(0), "date de début d'exercice");
  Jour closing = requiredDay(e->parametre(2), "date de clôture");
  MEM02.initRequete();
  MEM02.vide();
  year_month current = start->year() / start->month();
  year_month last = closing->year() / closing->month();
  for (; current <= last; current += months(1)) {
    MEM02.raz();
    ANMOI = host::yearMonth(current / day(1));
    MEM02.ecrit();
  }
}

void Compta::options_dossier(Evt* e) {
  exigerParametres(e, kOptionCount);
  if (!lireParametres()) throw HostError("paramètres du dossier introuvables : options inconnues");
  for (int i = 0; i < kOptionCount; ++i) e->parametre(i) = PARAM.valeur(kOptions[i]).estVide() ? 0 : 1;
}

void Compta::lecture_histo_txtva(Evt* e) {
  exigerParametres(e, 3);
  std::string code = e->parametre(0).chaine();
  Jour day = e->parametre(1).jour();
  if (!day) day = clock::today();
  Statement& s = session().base().prepare(
      "SELECT TXTVA FROM HISTVA WHERE COTVA = ? AND DTDEB <= ? ORDER BY DTDEB DESC LIMIT 1");
  s.bind(1, std::string_view(code));
  s.bind(2, std::string_view(jourIso(day)));
  bool found = s.step();
  double rate = found ? s.real(0) : 0;
  s.reset();
  e->parametre(2) = Valeur::reel(rate);
  erreurMethode(found ? 0 : 1, e);
}

void Compta::incremente_numero_piece(Evt* e) {
  exigerParametres(e, 4);
  std::string journal = e->parametre(0).chaine();
  std::string key = e->parametre(1).chaine();
  if (key != "N" && key != "N+1" && !isYearMonth(key))
    throw HostError("clé « " + key + " » du compteur de pièces du journal « " + journal + " » invalide");
  Database& db = session().base();
  if (colonne(db, "SELECT NUMJL FROM JONAL WHERE NUMJL = ?", {journal}).empty())
    throw HostError("journal « " + journal + " » inexistant");

  // Inside a user action the unit of work already holds the dossier. Outside one, a
  // unit of our own is taken without waiting: a counter that another process is
  // drawing from is reported at once, and the user tries again.
  bool own = db.profondeur() == 0;
  if (own && !essayerUnite(db)) {
    e->parametre(3) = 2;
    return;
  }
  try {
    std::vector<std::string> last =
        colonne(db, "SELECT NUMERO FROM NUMPI WHERE NUMJL = ? AND CLE = ?", {journal, key});
    long long next = (last.empty() ? 0 : std::stoll(last.front())) + 1;
    int error = 0;
    try {
      Statement& s = db.prepare(
          "INSERT INTO NUMPI (NUMJL, CLE, NUMERO) VALUES (?, ?, ?) "
          "ON CONFLICT (NUMJL, CLE) DO UPDATE SET NUMERO = excluded.NUMERO");
      s.bind(1, std::string_view(journal)).bind(2, std::string_view(key)).bind(3, next);
      s.step();
      s.reset();
    } catch (const HostError&) {
      error = 1;
    }
    if (own) db.commit();
    e->parametre(2) = next;
    e->parametre(3) = error;
  } catch (...) {
    if (own) db.rollback();
    throw;
  }
}

void Compta::prefixe_numero_piece(Evt* e) {
  exigerParametres(e, 3);
  std::string prefix = e->parametre(0).chaine();
  std::string moano = e->parametre(1).chaine();
  if (!isYearMonth(moano)) throw HostError("année et mois « " + moano + " » invalides (AAAAMM attendu)");
  host::text::replaceAll(prefix, "[AAAA]", moano.substr(0, 4));
  host::text::replaceAll(prefix, "[AA]", moano.substr(2, 2));
  host::text::replaceAll(prefix, "[MM]", moano.substr(4, 2));
  e->parametre(2) = prefix;
}

void Compta::libelle_nature_compte(Evt* e) {
  exigerParametres(e, 2);
  std::string letters = text::trim(e->parametre(0).chaine());
  std::string label;
  for (char letter : letters) {
    if (letter == ' ') continue;
    std::string one;
    try {
      one = libelle(std::string("NATURE_") + letter);
    } catch (const HostError&) {
      throw HostError(std::string("nature de compte « ") + letter + " » inconnue");
    }
    label += (label.empty() ? "" : " / ") + one;
  }
  e->parametre(1) = label;
}

void Compta::calcul_cumuls_compte(Evt* e) {
  exigerParametres(e, 6);
  std::string account = e->parametre(0).chaine();
  Jour from = e->parametre(2).jour(), to = e->parametre(3).jour();
  // An account's movements in date order are those of the index INDX2 (account, "|",
  // day): the sum reads them only, however many movements the ledger holds.
  Statement& s = session().base().prepare(
      "SELECT MTDEB, MTCRE FROM MOUVE WHERE INDX2 >= ?1 AND INDX2 <= ?2 AND NUMCP = ?3");
  std::string lowest = account + "|" + jourIso(from), highest = account + "|" + (to ? jourIso(to) : "~");
  s.bind(1, std::string_view(lowest)).bind(2, std::string_view(highest)).bind(3, std::string_view(account));
  Decimal debit, credit;
  try {
    while (s.step()) {
      debit += Valeur::depuisTexte(Genre::Monnaie, s.text(0), "MOUVE.MTDEB").decimal();
      credit += Valeur::depuisTexte(Genre::Monnaie, s.text(1), "MOUVE.MTCRE").decimal();
    }
  } catch (...) {
    s.reset();
    throw;
  }
  s.reset();
  Devises& devises = euro();
  std::string keeping = devises.tenue();
  std::string wanted = e->nbParams() > 6 ? e->parametre(6).chaine() : keeping;
  if (!wanted.empty() && wanted != keeping) {
    debit = devises.arrondir(devises.convertir(debit, keeping, wanted, to), wanted);
    credit = devises.arrondir(devises.convertir(credit, keeping, wanted, to), wanted);
  }
  e->parametre(4) = debit;
  e->parametre(5) = credit;
}

void Compta::mess_on(Evt* e) {
  bool yes = questionOuiNon(*this, e);
  if (e->nbParams() > 1) e->parametre(1) = yes ? 1 : 0;
}

// ---------------------------------------------------------------------------- modules

void Visuecri::faire(Evt* e) {
  exigerParametres(e, 1);
  std::string piece = e->parametre(0).chaine();
  Database& db = session().base();
  Statement& head = db.prepare("SELECT NUMJL, NPIEC, DTOPE, LIBPI, INPIE FROM PIECE WHERE NPIES = ?");
  head.bind(1, std::string_view(piece));
  if (!head.step()) {
    head.reset();
    session().montrer("La pièce <" + piece + "> est inexistante !");
    return;
  }
  std::string label = head.text(3).empty() ? head.text(4) : head.text(3);
  std::string text = "Pièce <" + piece + "> - journal " + head.text(0) + " - n° " + head.text(1) + " du " +
                     Valeur::depuisTexte(Genre::Date, head.text(2), "PIECE.DTOPE").chaine() + "@" + label;
  head.reset();

  Devises& devises = euro();
  int decimals = devises.decimales(devises.tenue());
  Decimal debit, credit;
  Statement& lines = db.prepare("SELECT NUMCP, LIBEC, MTDEB, MTCRE FROM MOUVE WHERE NPIES = ? ORDER BY NLIGS, UNIQ");
  lines.bind(1, std::string_view(piece));
  try {
    while (lines.step()) {
      Decimal d = Valeur::depuisTexte(Genre::Monnaie, lines.text(2), "MOUVE.MTDEB").decimal();
      Decimal c = Valeur::depuisTexte(Genre::Monnaie, lines.text(3), "MOUVE.MTCRE").decimal();
      debit += d;
      credit += c;
      text += "@" + lines.text(0) + " " + lines.text(1) + " : débit " + money(d, decimals) + ", crédit " +
              money(c, decimals);
    }
  } catch (...) {
    lines.reset();
    throw;
  }
  lines.reset();
  text += "@Total : débit " + money(debit, decimals) + ", crédit " + money(credit, decimals);
  session().montrer(text);
}

void Lance_reouverture_annu::faire(Evt* e) {
  Table param(this, "", "PARAM", "");
  Champ pnume("PNUME", &param), pxclo("PXCLO", &param);
  if (param.lit(3, pnume, '=', Valeur::entier(1)) != 0) {
    session().montrer(libelle("0028"));
    return;
  }
  if (pxclo == "O") {
    session().montrer("L'exercice est clôturé définitivement : sa réouverture est impossible.");
    return;
  }
  if (pxclo != "C") return;  // open already: nothing to reopen
  std::string period = jourTexte(param.valeur("PDDEX").jour()) + " au " + jourTexte(param.valeur("PDFEX").jour());
  if (!session().demander("L'exercice du " + period + " est clôturé.@Confirmez-vous sa réouverture ?")) return;
  pxclo = "N";
  param.ecrit();
  session().montrer("L'exercice du " + period + " est rouvert.");
}

void Choix_modele_ecritures::faire(Evt* e) {
  exigerParametres(e, 4);
  std::string journal = e->parametre(3).chaine();
  std::vector<std::string> codes =
      journal.empty() ? colonne(session().base(), "SELECT CODE FROM MODTE ORDER BY CODE")
                      : colonne(session().base(), "SELECT CODE FROM MODTE WHERE NUMJL = ? ORDER BY CODE", {journal});
  std::optional<std::string> pick =
      fenetreDeChoix(session(), journal.empty() ? "Modèles d'écritures" : "Modèles d'écritures du journal " + journal,
                     codes);
  if (pick) e->parametre(1) = *pick;
  e->parametre(0) = pick ? 1 : 0;
}

Choix_table::Choix_table(Evt* e, const char* window, const char* table, const char* code, const char* label)
    : Traitmnt(e), window_(window), table_(table), code_(code), label_(label) {}

void Choix_table::faire(Evt* e) {
  exigerParametres(e, 2);
  std::vector<std::string> codes =
      colonne(session().base(), std::string("SELECT ") + code_ + " FROM " + table_ + " ORDER BY " + label_);
  std::optional<std::string> pick = fenetreDeChoix(session(), window_, codes);
  if (pick) e->parametre(0) = *pick;
  e->parametre(1) = pick ? "0" : "1";
}

}  // namespace services
