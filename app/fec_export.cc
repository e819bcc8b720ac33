#include "app/fec_export.h"

#include <chrono>
#include <map>
#include <vector>

#include "host/currency.h"
#include "host/decimal.h"
#include "host/error.h"
#include "host/text.h"
#include "host/value.h"

namespace app {

using namespace std::chrono;
using host::Decimal;

namespace {

constexpr int kColumns = 18;
const char* const kHeader[kColumns] = {"JournalCode", "JournalLib",    "EcritureNum", "EcritureDate", "CompteNum",
                                       "CompteLib",   "CompAuxNum",    "CompAuxLib",  "PieceRef",     "PieceDate",
                                       "EcritureLib", "Debit",         "Credit",      "EcritureLet",  "DateLet",
                                       "ValidDate",   "Montantdevise", "Idevise"};
// Columns that may not be empty on any line.
constexpr int kRequired[] = {0, 1, 2, 3, 4, 5, 8, 9, 10, 11, 12, 15};

std::string text(host::Database& db, const std::string& sql, const std::string& key = {}) {
  host::Statement& s = db.prepare(sql);
  if (!key.empty()) s.bind(1, key);
  std::string value = s.step() ? s.text(0) : std::string();
  s.reset();
  return value;
}

year_month_day storedDay(host::Database& db, const char* column) {
  auto day = host::lireJour(text(db, std::string("SELECT \"") + column + "\" FROM PARAM WHERE PNUME = 1"));
  if (!day || !*day) throw host::HostError(std::string("la date ") + column + " du dossier est vide ou illisible");
  return **day;
}

// YYYYMMDD from a stored YYYY-MM-DD; "" for a text that is not a day.
std::string compactDay(const std::string& stored) {
  auto day = host::lireJour(stored);
  if (!day || !*day || host::jourIso(*day) != stored) return "";
  std::string out = stored;
  std::erase(out, '-');
  return out;
}

std::string frenchAmount(const Decimal& amount, int decimals) {
  std::string out = host::amountText(amount, decimals);
  for (char& c : out)
    if (c == '.') c = ',';
  return out;
}

// ISO 8859-15 for UTF-8 text. The typographic marks a keyboard slips in are written
// as their plain forms; any other character the encoding lacks is a fault.
std::optional<std::string> toLatin9(std::string_view s) {
  std::string out;
  for (std::size_t i = 0; i < s.size();) {
    unsigned char c = static_cast<unsigned char>(s[i]);
    char32_t code;
    std::size_t length = c < 0x80 ? 1 : (c & 0xE0) == 0xC0 ? 2 : (c & 0xF0) == 0xE0 ? 3 : 4;
    if (i + length > s.size()) return std::nullopt;
    code = length == 1 ? c : length == 2 ? c & 0x1F : length == 3 ? c & 0x0F : c & 0x07;
    for (std::size_t k = 1; k < length; ++k) code = (code << 6) | (static_cast<unsigned char>(s[i + k]) & 0x3F);
    i += length;
    static const std::map<char32_t, const char*> plain = {{0x2018, "'"},   {0x2019, "'"}, {0x201C, "\""},
                                                          {0x201D, "\""},  {0x2013, "-"}, {0x2014, "-"},
                                                          {0x2026, "..."}, {0x202F, " "}, {0x2009, " "}};
    static const std::map<char32_t, char> latin9 = {{0x20AC, '\xA4'}, {0x0160, '\xA6'}, {0x0161, '\xA8'},
                                                    {0x017D, '\xB4'}, {0x017E, '\xB8'}, {0x0152, '\xBC'},
                                                    {0x0153, '\xBD'}, {0x0178, '\xBE'}};
    if (auto p = plain.find(code); p != plain.end()) {
      out += p->second;
    } else if (auto l = latin9.find(code); l != latin9.end()) {
      out += l->second;
    } else if (code < 0x100 && code != 0xA4 && code != 0xA6 && code != 0xA8 && code != 0xB4 && code != 0xB8 &&
               code != 0xBC && code != 0xBD && code != 0xBE) {
      out += static_cast<char>(code);
    } else {
      return std::nullopt;
    }
  }
  return out;
}

struct Line {
  std::string npies;  // the ledger piece, to name a fault
  std::string fields[kColumns];
  Decimal debit, credit;
};

}  // namespace

FecFile exporterFec(host::Database& db, const FecRequest& request) {
  year_month_day first = storedDay(db, "PDDEX"), last = storedDay(db, "PDFEX");
  if (request.year) {
    years shift{*request.year - static_cast<int>(last.year())};
    first = first + shift;
    last = last + shift;
    // A last day of February stays the last day when the year changes.
    if (!last.ok()) last = year_month_day(last.year() / last.month() / std::chrono::last);
    if (!first.ok()) first = year_month_day(sys_days(first.year() / first.month() / std::chrono::last) + days(1));
  }
  const std::string from = host::jourIso(first), to = host::jourIso(last);

  std::string keeping = text(db, "SELECT MONNAIE_IDENT FROM PARAM WHERE PNUME = 1");
  if (keeping.empty()) keeping = "EUR";
  auto decimalsOf = [&](const std::string& currency) {
    std::string d = text(db, "SELECT DECIMALES FROM MONNAIE WHERE IDENT = ?", currency);
    return d.empty() ? 2 : std::stoi(d);
  };
  const int decimals = decimalsOf(keeping);

  std::vector<Line> lines;
  host::Statement& s = db.prepare(
      "SELECT p.NPIES, p.NUMJL, coalesce(j.LIBELLE, ''), p.DTOPE, m.NUMCP, coalesce(c.LIBCP, ''), "
      "  CASE WHEN p.NPIEC <> '' THEN p.NPIEC ELSE p.NPIES END, CASE WHEN p.DTPIE <> '' THEN p.DTPIE ELSE p.DTOPE END, "
      "  CASE WHEN m.LIBEC <> '' THEN m.LIBEC WHEN p.LIBPI <> '' THEN p.LIBPI ELSE p.INPIE END, "
      "  m.MTDEB, m.MTCRE, m.RELET, m.DTLET, p.DTCRE, m.MTDEBS, m.MTCRES, m.MONNAIE_IDENT, m.DTOPE "
      "FROM PIECE p JOIN MOUVE m ON m.NPIES = p.NPIES "
      "LEFT JOIN JONAL j ON j.NUMJL = p.NUMJL LEFT JOIN COMPT c ON c.NUMCP = m.NUMCP "
      "WHERE p.DTOPE BETWEEN ?1 AND ?2 ORDER BY p.NPIES, m.NLIGS");
  s.bind(1, from).bind(2, to);
  std::string previous;
  int number = 0;
  try {
    while (s.step()) {
      Line line;
      line.npies = s.text(0);
      if (line.npies != previous) ++number;
      previous = line.npies;
      auto amount = [&](int column) {
        std::string stored = s.text(column);
        auto value = stored.empty() ? std::optional<Decimal>(Decimal()) : Decimal::parse(stored);
        if (!value) throw host::HostError("pièce " + line.npies + " : « " + stored + " » n'est pas un montant");
        return *value;
      };
      line.debit = amount(9);
      line.credit = amount(10);
      std::string currency = s.text(16);
      bool foreign = !currency.empty() && currency != keeping;
      Decimal inCurrency = amount(14).isZero() ? amount(15) : amount(14);
      std::string* f = line.fields;
      f[0] = s.text(1);
      f[1] = s.text(2);
      f[2] = std::to_string(number);
      f[3] = compactDay(s.text(3));
      f[4] = s.text(4);
      f[5] = s.text(5);
      f[8] = s.text(6);
      f[9] = compactDay(s.text(7));
      f[10] = s.text(8);
      f[11] = frenchAmount(line.debit, decimals);
      f[12] = frenchAmount(line.credit, decimals);
      f[13] = s.text(11);
      f[14] = compactDay(s.text(12));
      f[15] = compactDay(s.text(13));
      f[16] = foreign ? frenchAmount(inCurrency, decimalsOf(currency)) : "";
      f[17] = foreign ? currency : "";
      // A movement dated apart from its piece would not be where the piece says.
      if (s.text(17) != s.text(3))
        throw host::HostError("pièce " + line.npies + " : un mouvement daté du " + s.text(17) + ", la pièce du " +
                              s.text(3));
      lines.push_back(std::move(line));
    }
  } catch (...) {
    s.reset();
    throw;
  }
  s.reset();

  // The file's own checks, line by line and piece by piece.
  FecFile file;
  std::string content;
  for (int c = 0; c < kColumns; ++c) content += std::string(c ? 1 : 0, request.separator) + kHeader[c];
  content += "\n";
  std::map<std::string, std::pair<Decimal, Decimal>> totals;
  for (const Line& line : lines) {
    auto fault = [&](const std::string& why) {
      throw host::HostError("écritures refusées, pièce " + line.npies + " (EcritureNum " + line.fields[2] +
                            ") : " + why);
    };
    for (int c : kRequired)
      if (line.fields[c].empty()) fault(std::string("le champ ") + kHeader[c] + " est vide ou illisible");
    if (line.fields[3] < compactDay(from) || line.fields[3] > compactDay(to))
      fault("la date " + line.fields[3] + " est hors de l'exercice");
    for (int c = 0; c < kColumns; ++c) {
      const std::string& value = line.fields[c];
      if (host::text::flaw(value) || value.find(request.separator) != std::string::npos)
        fault(std::string("le champ ") + kHeader[c] + " « " + value +
              " » contient le séparateur ou un caractère de contrôle");
      auto encoded = toLatin9(value);
      if (!encoded) fault(std::string("le champ ") + kHeader[c] + " « " + value + " » a un caractère hors ISO 8859-15");
      content += std::string(c ? 1 : 0, request.separator) + *encoded;
    }
    content += "\n";
    auto& [debit, credit] = totals[line.fields[2]];
    debit += line.debit;
    credit += line.credit;
  }
  for (const auto& [num, total] : totals)
    if (total.first != total.second)
      throw host::HostError("écritures refusées : l'écriture " + num + " n'est pas équilibrée (débit " +
                            host::amountText(total.first, decimals) + ", crédit " +
                            host::amountText(total.second, decimals) + ")");

  std::string siren = text(db, "SELECT VALEUR FROM DOSSIER_INFO WHERE CLE = 'company_siren'");
  if (!siren.empty()) file.name = siren + "FEC" + compactDay(to) + ".txt";
  file.content = std::move(content);
  file.lines = static_cast<int>(lines.size());
  return file;
}

}  // namespace app
