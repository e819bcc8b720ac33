#include "app/dossier_setup.h"

#include <algorithm>
#include <iomanip>

#include "host/error.h"
#include "host/text.h"
#include "host/value.h"
#include "registry/dossier.h"

extern const char* const company_sql;

namespace app {

using namespace std::chrono;

namespace {

std::string sqlLiteral(const std::string& text) {
  std::string out = "'";
  for (char c : text) out += c == '\'' ? std::string("''") : std::string(1, c);
  return out + "'";
}

std::string firstValue(host::Database& db, const std::string& sql, const std::string& parameter = {}) {
  host::Statement& s = db.prepare(sql);
  if (sql.find('?') != std::string::npos) s.bind(1, parameter);
  std::string value = s.step() ? s.text(0) : std::string();
  s.reset();
  return value;
}

bool exists(host::Database& db, const std::string& sql, const std::string& key) {
  host::Statement& s = db.prepare(sql);
  s.bind(1, key);
  bool found = s.step();
  s.reset();
  return found;
}

// ---- option values: each check returns the value as stored, or throws the reason

[[noreturn]] void refuse(const std::string& why) { throw host::HostError(why); }

bool allDigits(std::string_view s) {
  return !s.empty() && std::all_of(s.begin(), s.end(), [](char c) { return c >= '0' && c <= '9'; });
}

std::string cleanText(std::string_view value, std::size_t longest) {
  if (auto why = host::text::flaw(value)) refuse(*why);
  std::string text = host::text::trim(value);
  if (host::text::length(text) > longest) refuse("plus de " + std::to_string(longest) + " caractères");
  return text;
}

year_month_day dayOf(std::string_view value) {
  auto day = host::lireJour(value);
  if (!day || !*day) refuse("« " + std::string(value) + " » n'est pas une date (JJ/MM/AAAA)");
  return **day;
}

year_month_day storedDay(host::Database& db, const char* column) {
  auto day = host::lireJour(firstValue(db, std::string("SELECT \"") + column + "\" FROM PARAM WHERE PNUME = 1"));
  if (!day || !*day) refuse(std::string("la date ") + column + " du dossier est vide ou illisible");
  return **day;
}

// An exercise runs from its first day to its last, for at most 24 months.
void checkExercise(year_month_day first, year_month_day last) {
  if (sys_days(last) < sys_days(first))
    refuse("l'exercice finirait le " + host::jourTexte(last) + ", avant son début le " + host::jourTexte(first));
  if (sys_days(last) >= sys_days(first + months(24)))
    refuse("un exercice dure au plus 24 mois (du " + host::jourTexte(first) + " au " + host::jourTexte(last) + ")");
}

// A value among a few codes, as a template argument so that each list is a plain
// function an option can point to.
template <std::size_t N>
struct Code {
  constexpr Code(const char (&text)[N]) { std::copy_n(text, N, value); }
  char value[N];
};

template <Code... allowed>
std::string oneOf(host::Database&, std::string_view v) {
  if (((v != std::string_view(allowed.value)) && ...)) {
    std::string list;
    ((list += (list.empty() ? "" : ", ") + std::string(*allowed.value ? allowed.value : "vide")), ...);
    refuse("valeurs permises : " + list);
  }
  return std::string(v);
}

std::string flag(host::Database&, std::string_view v) {
  if (v != "0" && v != "1") refuse("valeurs permises : 1 (oui), 0 (non)");
  return std::string(v);
}

std::string account(host::Database& db, std::string_view v) {
  if (!exists(db, "SELECT 1 FROM COMPT WHERE NUMCP = ?", std::string(v))) refuse("compte inconnu");
  return std::string(v);
}

std::string journal(host::Database& db, std::string_view v) {
  if (!exists(db, "SELECT 1 FROM JONAL WHERE NUMJL = ?", std::string(v))) refuse("journal inconnu");
  return std::string(v);
}

struct Option {
  const char* name;
  bool company;  // a DOSSIER_INFO key; otherwise a PARAM column of the same name
  std::string (*check)(host::Database& db, std::string_view value);
  const char* description;
};

const Option kOptions[] = {
    {"company_name", true,
     [](host::Database&, std::string_view v) {
       std::string text = cleanText(v, 100);
       if (text.empty()) refuse("le nom de la société ne peut être vide");
       return text;
     },
     "Raison sociale de la société"},
    {"company_address", true, [](host::Database&, std::string_view v) { return cleanText(v, 100); },
     "Adresse (numéro et voie)"},
    {"company_postcode", true,
     [](host::Database&, std::string_view v) {
       std::string text = cleanText(v, 5);
       if (!text.empty() && (text.size() != 5 || !allDigits(text))) refuse("un code postal a 5 chiffres");
       return text;
     },
     "Code postal"},
    {"company_town", true, [](host::Database&, std::string_view v) { return cleanText(v, 60); }, "Ville"},
    {"company_siren", true,
     [](host::Database&, std::string_view v) {
       std::string text;
       for (char c : v)
         if (c != ' ') text += c;
       if (text.size() != 9 || !allDigits(text)) refuse("un SIREN a 9 chiffres");
       // The ninth digit is the key of the other eight (Luhn): every second digit from
       // the right doubled, the sum of all digits a multiple of ten.
       int sum = 0;
       for (int i = 0; i < 9; ++i) {
         int digit = text[8 - i] - '0';
         if (i % 2 == 1) digit = digit * 2 > 9 ? digit * 2 - 9 : digit * 2;
         sum += digit;
       }
       if (sum % 10 != 0) refuse("« " + text + " » n'est pas un SIREN : sa clé de contrôle est fausse");
       return text;
     },
     "SIREN (9 chiffres), qui nomme le fichier des écritures comptables"},
    {"PDDEX", false,
     [](host::Database& db, std::string_view v) {
       year_month_day first = dayOf(v);
       checkExercise(first, storedDay(db, "PDFEX"));
       return host::jourIso(first);
     },
     "Premier jour de l'exercice en cours"},
    {"PDFEX", false,
     [](host::Database& db, std::string_view v) {
       year_month_day last = dayOf(v);
       checkExercise(storedDay(db, "PDDEX"), last);
       return host::jourIso(last);
     },
     "Dernier jour de l'exercice en cours"},
    {"PDTCL", false,
     [](host::Database& db, std::string_view v) {
       year_month_day closing = dayOf(v);
       year_month_day first = storedDay(db, "PDDEX"), last = storedDay(db, "PDFEX");
       if (sys_days(closing) < sys_days(first) || sys_days(closing) > sys_days(last + years(1)))
         refuse("la date de clôture doit tomber entre le début de l'exercice (" + host::jourTexte(first) +
                ") et la fin de l'exercice suivant");
       return host::jourIso(closing);
     },
     "Date de clôture : dernière date d'opération ouverte à la saisie"},
    {"PXCLO", false, oneOf<"N", "C", "O">, "État de l'exercice : N ouvert, C clôturé mais réouvrable, O clôturé"},
    {"PRE18", false, oneOf<"O", "N">, "O : opérations simplifiées en service"},
    {"PRE19", false, oneOf<"1", "0">,
     "1 : lignes de banque et de caisse sur comptes de charges ou de produits, 0 : sur comptes de tiers"},
    {"PFO13", false, oneOf<"O", "N">, "O : les lignes de banque et de caisse justifient les échéances réglées"},
    {"PMTVA", false, oneOf<"D", "E", "">,
     "Exigibilité de la TVA : D sur les débits, E sur les encaissements, vide selon le compte"},
    {"PCECC", false, account, "Compte des pertes de change"},
    {"PCECP", false, account, "Compte des gains de change"},
    {"PCEEC", false, account, "Compte des écarts d'arrondi débiteurs"},
    {"PCEEP", false, account, "Compte des écarts d'arrondi créditeurs"},
    {"PJOCHAN", false, journal, "Journal des écarts de change"},
    {"PJOEURO", false, journal, "Journal des écarts d'arrondi"},
};

const Option kFlags[] = {
    {"OPT_TVA", false, flag, "Gestion de la TVA"},
    {"OPT_TVA1", false, flag, "TVA sur les débits ou les encaissements"},
    {"OPT_ANA", false, flag, "Comptabilité analytique"},
    {"OPT_ANA1", false, flag, "Analytique sur toutes les natures de comptes"},
    {"OPT_ANA2", false, flag, "Postes analytiques"},
    {"OPT_ECHCLI", false, flag, "Échéances des clients"},
    {"OPT_ECHFOU", false, flag, "Échéances des fournisseurs"},
    {"OPT_ECHAUT", false, flag, "Échéances des autres tiers"},
    {"OPT_ECH", false, flag, "Gestion des échéances"},
    {"OPT_DEVISE", false, flag, "Devises étrangères"},
    {"OPT_REGT", false, flag, "Règlements"},
};

template <typename F>
void eachOption(F&& f) {
  for (const Option& o : kOptions) f(o);
  for (const Option& o : kFlags) f(o);
}

std::string storedValue(host::Database& db, const Option& o) {
  if (o.company) return firstValue(db, "SELECT VALEUR FROM DOSSIER_INFO WHERE CLE = ?", o.name);
  return firstValue(db, std::string("SELECT \"") + o.name + "\" FROM PARAM WHERE PNUME = 1");
}

}  // namespace

void creerSociete(const std::string& path, const Company& company) {
  if (auto why = host::text::flaw(company.name)) throw host::HostError("nom de société refusé : " + *why);
  if (host::text::trim(company.name).empty()) throw host::HostError("le nom de la société ne peut être vide");
  const std::string& currency = company.currency;
  if (currency.size() != 3 ||
      !std::all_of(currency.begin(), currency.end(), [](char c) { return c >= 'A' && c <= 'Z'; }))
    throw host::HostError("« " + currency + " » n'est pas un code de devise (trois lettres majuscules, EUR)");
  year_month_day first = company.exerciseStart;
  year_month_day last = year_month_day(sys_days(first + months(12)) - days(1));
  std::string sql = company_sql;
  host::text::replaceAll(sql, "{{COMPANY}}", sqlLiteral(host::text::trim(company.name)));
  host::text::replaceAll(sql, "{{MONNAIE}}", currency);
  host::text::replaceAll(sql, "{{PDDEX}}", host::jourIso(first));
  host::text::replaceAll(sql, "{{PDFEX}}", host::jourIso(last));
  host::text::replaceAll(sql, "{{PDTCL}}", host::jourIso(last));
  // A keeping currency outside the usual ones is kept with two decimals.
  sql += "\nINSERT OR IGNORE INTO \"MONNAIE\" (\"IDENT\", \"LIBELLE\", \"DECIMALES\", \"ZONE_EURO\") VALUES ('" +
         currency + "', '" + currency + "', 2, 'N');\n";
  registry::creerDossier(path, sql);
}

void definirOption(host::Database& db, const std::string& option, const std::string& value) {
  const Option* found = nullptr;
  eachOption([&](const Option& o) {
    if (option == o.name) found = &o;
  });
  if (!found) throw host::HostError("option inconnue « " + option + " » (mirvae show liste les options)");
  host::Transaction unit(db);
  std::string stored;
  try {
    stored = found->check(db, value);
  } catch (const host::HostError& error) {
    throw host::HostError("valeur refusée pour " + option + " : " + error.what());
  }
  if (found->company) {
    host::Statement& s = db.prepare("INSERT OR REPLACE INTO DOSSIER_INFO (CLE, VALEUR) VALUES (?, ?)");
    s.bind(1, option).bind(2, stored);
    s.step();
    s.reset();
  } else {
    if (firstValue(db, "SELECT count(*) FROM PARAM WHERE PNUME = 1") != "1")
      throw host::HostError("le dossier n'a pas de paramètres (PARAM) : créez-le avec mirvae init --company");
    host::Statement& s = db.prepare(std::string("UPDATE PARAM SET \"") + option + "\" = ? WHERE PNUME = 1");
    s.bind(1, stored);
    s.step();
    s.reset();
  }
  unit.commit();
}

void afficherOptions(host::Database& db, std::ostream& out) {
  eachOption([&](const Option& o) {
    std::string value = storedValue(db, o);
    std::size_t shown = host::text::length(value);
    out << std::left << std::setw(18) << o.name << value << std::string(shown < 14 ? 14 - shown : 2, ' ')
        << o.description << "\n";
  });
}

}  // namespace app
