// Bringing a company's chart, tiers and currency rates in from CSV files, as
// spreadsheets and other programs write them.
#include <algorithm>
#include <fstream>
#include <map>
#include <optional>
#include <sstream>

#include "app/dossier_setup.h"
#include "host/decimal.h"
#include "host/error.h"
#include "host/text.h"
#include "host/value.h"

namespace app {

namespace {

// ---- encodings

void appendUtf8(std::string& out, char32_t c) {
  if (c < 0x80) {
    out += static_cast<char>(c);
  } else if (c < 0x800) {
    out += static_cast<char>(0xC0 | (c >> 6));
    out += static_cast<char>(0x80 | (c & 0x3F));
  } else {
    out += static_cast<char>(0xE0 | (c >> 12));
    out += static_cast<char>(0x80 | ((c >> 6) & 0x3F));
    out += static_cast<char>(0x80 | (c & 0x3F));
  }
}

bool validUtf8(std::string_view s) {
  for (std::size_t i = 0; i < s.size();) {
    unsigned char c = static_cast<unsigned char>(s[i]);
    std::size_t extra;
    if (c < 0x80)
      extra = 0;
    else if (c >= 0xC2 && c < 0xE0)
      extra = 1;
    else if (c >= 0xE0 && c < 0xF0)
      extra = 2;
    else if (c >= 0xF0 && c < 0xF5)
      extra = 3;
    else
      return false;
    if (s.size() - i <= extra) return false;
    for (std::size_t k = 1; k <= extra; ++k)
      if ((static_cast<unsigned char>(s[i + k]) & 0xC0) != 0x80) return false;
    i += extra + 1;
  }
  return true;
}

// Windows-1252, the encoding French spreadsheets save "CSV" in: Latin-1 but for
// 0x80-0x9F, where it keeps the euro sign, typographic quotes, Œ and the like.
// Bytes it leaves undefined are refused with their position.
std::string fromCp1252(std::string_view s) {
  static const char32_t high[32] = {0x20AC, 0,      0x201A, 0x0192, 0x201E, 0x2026, 0x2020, 0x2021,
                                    0x02C6, 0x2030, 0x0160, 0x2039, 0x0152, 0,      0x017D, 0,
                                    0,      0x2018, 0x2019, 0x201C, 0x201D, 0x2022, 0x2013, 0x2014,
                                    0x02DC, 0x2122, 0x0161, 0x203A, 0x0153, 0,      0x017E, 0x0178};
  std::string out;
  for (std::size_t i = 0; i < s.size(); ++i) {
    unsigned char c = static_cast<unsigned char>(s[i]);
    char32_t code = c >= 0x80 && c < 0xA0 ? high[c - 0x80] : c;
    if (code == 0) {
      std::ostringstream why;
      why << "le fichier n'est ni en UTF-8 ni en Windows-1252 (octet 0x" << std::hex << std::uppercase
          << static_cast<int>(c) << " à l'octet " << std::dec << i + 1 << ")";
      throw host::HostError(why.str());
    }
    appendUtf8(out, code);
  }
  return out;
}

// ---- CSV

struct Row {
  int line;
  std::vector<std::string> fields;
  std::string error;  // a line that cannot be split (an open quote)
};

std::vector<std::string> splitFields(std::string_view line, char separator, std::string& error) {
  std::vector<std::string> fields(1);
  bool quoted = false;
  for (std::size_t i = 0; i < line.size(); ++i) {
    char c = line[i];
    if (quoted) {
      if (c == '"' && i + 1 < line.size() && line[i + 1] == '"') {
        fields.back() += '"';
        ++i;
      } else if (c == '"') {
        quoted = false;
      } else {
        fields.back() += c;
      }
    } else if (c == '"') {
      quoted = true;
    } else if (c == separator) {
      fields.emplace_back();
    } else {
      fields.back() += c;
    }
  }
  if (quoted) error = "guillemet ouvert et jamais fermé";
  for (auto& f : fields) f = host::text::trim(f);
  return fields;
}

struct Csv {
  std::vector<std::string> header;
  std::vector<Row> rows;
};

Csv readCsv(const std::string& file) {
  std::ifstream in(file, std::ios::binary);
  if (!in) throw host::HostError("fichier « " + file + " » illisible");
  std::string bytes{std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>()};
  if (bytes.rfind("\xEF\xBB\xBF", 0) == 0) bytes.erase(0, 3);
  std::string text = validUtf8(bytes) ? bytes : fromCp1252(bytes);

  Csv csv;
  char separator = 0;
  std::istringstream lines(text);
  int number = 0;
  for (std::string line; std::getline(lines, line);) {
    ++number;
    if (!line.empty() && line.back() == '\r') line.pop_back();
    if (host::text::trim(line).empty()) continue;
    if (!separator) {
      // The header says how the file is separated: a semicolon, as French settings
      // write it, or else a comma.
      separator = line.find(';') != std::string::npos ? ';' : ',';
      std::string error;
      csv.header = splitFields(line, separator, error);
      if (!error.empty()) throw host::HostError("en-tête, ligne " + std::to_string(number) + " : " + error);
      continue;
    }
    Row row{number, {}, {}};
    row.fields = splitFields(line, separator, row.error);
    csv.rows.push_back(std::move(row));
  }
  if (!separator) throw host::HostError("fichier « " + file + " » vide : il lui faut au moins sa ligne d'en-tête");
  return csv;
}

// ---- what each kind of file holds

struct Column {
  const char* name;   // the dictionary's column, accepted as a heading
  const char* alias;  // the French heading a person writes
  bool required;
};

const std::vector<Column>& columnsOf(ImportKind kind) {
  static const std::vector<Column> accounts = {
      {"NUMCP", "compte", true}, {"LIBCP", "libelle", true},      {"NATUC", "nature", false},
      {"COTVA", "tva", false},   {"TPTVA", "exigibilite", false}, {"CPOST", "poste", false},
      {"CCRIT", "cle", false},   {"CSECT", "section", false},     {"SAANA", "analytique_obligatoire", false},
      {"CCTRA", "masque", false}};
  static const std::vector<Column> tiers = {{"NUMCP", "compte", true},         {"LIBCP", "nom", true},
                                            {"NATUC", "nature", false},        {"ADRE1", "adresse", false},
                                            {"ADRE2", "complement", false},    {"CPOCP", "code_postal", false},
                                            {"VILCP", "ville", false},         {"CTYPR", "conditions", false},
                                            {"JLTRT", "journal", false},       {"CTYEC", "type_echeance", false},
                                            {"RGPAY", "mode_reglement", false}};
  static const std::vector<Column> rates = {
      {"IDENT", "devise", true}, {"DTCOURS", "date", true}, {"COURS", "cours", true}};
  return kind == ImportKind::accounts ? accounts : kind == ImportKind::tiers ? tiers : rates;
}

std::string lower(std::string s) {
  std::transform(s.begin(), s.end(), s.begin(), [](unsigned char c) { return std::tolower(c); });
  return s;
}

// Where each known column is in the file; an unknown heading or a missing required
// column stops the import before any row is read.
std::map<std::string, std::size_t> placeColumns(ImportKind kind, const std::vector<std::string>& header) {
  std::map<std::string, std::size_t> at;
  for (std::size_t i = 0; i < header.size(); ++i) {
    const Column* found = nullptr;
    for (const Column& c : columnsOf(kind))
      if (lower(header[i]) == lower(c.name) || lower(header[i]) == c.alias) found = &c;
    if (!found) throw host::HostError("en-tête : colonne inconnue « " + header[i] + " »");
    if (at.count(found->name)) throw host::HostError("en-tête : colonne « " + header[i] + " » donnée deux fois");
    at[found->name] = i;
  }
  for (const Column& c : columnsOf(kind))
    if (c.required && !at.count(c.name))
      throw host::HostError(std::string("en-tête : colonne « ") + c.alias + " » (" + c.name + ") manquante");
  return at;
}

bool found(host::Database& db, const char* sql, const std::string& a, const std::string& b = {}) {
  host::Statement& s = db.prepare(sql);
  s.bind(1, a);
  if (std::string_view(sql).find("?2") != std::string_view::npos) s.bind(2, b);
  bool any = s.step();
  s.reset();
  return any;
}

std::string firstText(host::Database& db, const char* sql, const std::string& key) {
  host::Statement& s = db.prepare(sql);
  s.bind(1, key);
  std::string value = s.step() ? s.text(0) : std::string();
  s.reset();
  return value;
}

using Values = std::map<std::string, std::string>;

// The reason a row cannot be written, nothing when it can. Values may be completed
// (an account's nature from its number, a date in storage form).
std::optional<std::string> checkAccount(host::Database& db, ImportKind kind, Values& v) {
  const std::string& number = v["NUMCP"];
  if (number.empty() || number.size() > 20 || number[0] < '1' || number[0] > '9' ||
      !std::all_of(number.begin(), number.end(), [](unsigned char c) { return std::isdigit(c) || std::isupper(c); }))
    return "numéro de compte « " + number + " » : des chiffres et des majuscules, la classe (1 à 9) en tête";
  if (v["LIBCP"].empty()) return std::string("libellé vide");
  if (host::text::length(v["LIBCP"]) > 60) return std::string("libellé de plus de 60 caractères");
  if (found(db, "SELECT 1 FROM COMPT WHERE LIBCP = ?1 AND NUMCP <> ?2", v["LIBCP"], number))
    return "le libellé « " + v["LIBCP"] + " » est déjà celui d'un autre compte";
  if (kind == ImportKind::tiers && !v.count("NATUC") && !found(db, "SELECT 1 FROM COMPT WHERE NUMCP = ?", number)) {
    // A new tiers' nature follows its number, as the chart of accounts files them.
    v["NATUC"] = number.rfind("411", 0) == 0   ? "C"
                 : number.rfind("401", 0) == 0 ? "F"
                 : number.rfind("421", 0) == 0 ? "A"
                                               : "";
  }
  if (v.count("NATUC") || kind == ImportKind::tiers) {
    const std::string nature =
        v.count("NATUC") ? v["NATUC"] : firstText(db, "SELECT NATUC FROM COMPT WHERE NUMCP = ?", number);
    if (nature.find_first_not_of("CFABIPHMTUQRS") != std::string::npos)
      return "nature « " + nature + " » : lettres permises C F A B I P H M T U Q R S";
    if (kind == ImportKind::tiers && nature.find_first_of("CFA") == std::string::npos)
      return "le compte " + number + " n'est ni client (C), ni fournisseur (F), ni salarié (A)";
  }
  struct Reference {
    const char* column;
    const char* sql;
    const char* what;
  };
  static const Reference references[] = {
      {"COTVA", "SELECT 1 FROM CDTVA WHERE COTVA = ?", "code de TVA"},
      {"CPOST", "SELECT 1 FROM POANA WHERE IDENT = ?", "poste analytique"},
      {"CCRIT", "SELECT 1 FROM CRITA WHERE IDENT = ?", "clé de répartition"},
      {"CSECT", "SELECT 1 FROM SECAN WHERE CSECT = ?", "section analytique"},
      {"JLTRT", "SELECT 1 FROM JONAL WHERE NUMJL = ? AND TYPJL = 'T'", "journal de trésorerie"},
  };
  for (const Reference& r : references)
    if (v.count(r.column) && !v[r.column].empty() && !found(db, r.sql, v[r.column]))
      return std::string(r.what) + " inconnu « " + v[r.column] + " »";
  struct Choice {
    const char* column;
    std::initializer_list<const char*> allowed;
  };
  static const Choice choices[] = {{"TPTVA", {"", "D", "E"}}, {"SAANA", {"", "O", "N"}}, {"CCTRA", {"", "O", "N"}}};
  for (const Choice& c : choices)
    if (v.count(c.column) &&
        std::none_of(c.allowed.begin(), c.allowed.end(), [&](const char* a) { return v[c.column] == a; }))
      return std::string(c.column) + " « " + v[c.column] + " » : valeur non permise";
  return std::nullopt;
}

std::optional<std::string> checkRate(host::Database& db, Values& v) {
  const std::string& currency = v["IDENT"];
  if (!found(db, "SELECT 1 FROM MONNAIE WHERE IDENT = ?", currency)) return "devise inconnue « " + currency + " »";
  if (found(db, "SELECT 1 FROM PARAM WHERE PNUME = 1 AND MONNAIE_IDENT = ?", currency))
    return "« " + currency + " » est la devise de tenue du dossier : elle n'a pas de cours";
  if (found(db, "SELECT 1 FROM MONNAIE WHERE IDENT = ? AND COURS_FIXE <> 0", currency))
    return "« " + currency + " » a une parité fixe : elle n'a pas de cours";
  auto day = host::lireJour(v["DTCOURS"]);
  if (!day || !*day) return "« " + v["DTCOURS"] + " » n'est pas une date (JJ/MM/AAAA)";
  v["DTCOURS"] = host::jourIso(*day);
  std::string rate = v["COURS"];
  std::replace(rate.begin(), rate.end(), ',', '.');
  auto parsed = host::Decimal::parse(rate);
  if (!parsed || parsed->sign() <= 0) return "« " + v["COURS"] + " » n'est pas un cours positif";
  v["COURS"] = parsed->toString(0);
  return std::nullopt;
}

void write(host::Database& db, ImportKind kind, const Values& v) {
  std::string table = kind == ImportKind::rates ? "MONNAIE_COURS" : "COMPT";
  std::string key = kind == ImportKind::rates ? "\"IDENT\", \"DTCOURS\"" : "\"NUMCP\"";
  std::string columns, marks, updates;
  for (const auto& [column, value] : v) {
    columns += (columns.empty() ? "\"" : ", \"") + column + "\"";
    marks += marks.empty() ? "?" : ", ?";
    updates += (updates.empty() ? "\"" : ", \"") + column + "\" = excluded.\"" + column + "\"";
  }
  host::Statement& s = db.prepare("INSERT INTO \"" + table + "\" (" + columns + ") VALUES (" + marks +
                                  ") ON CONFLICT (" + key + ") DO UPDATE SET " + updates);
  int i = 0;
  for (const auto& [column, value] : v) {
    if (column == "COURS")
      s.bind(++i, host::Decimal::parse(value)->toDouble());
    else
      s.bind(++i, value);
  }
  s.step();
  s.reset();
}

}  // namespace

ImportReport importer(host::Database& db, ImportKind kind, const std::string& file, bool skipBad) {
  Csv csv = readCsv(file);
  auto at = placeColumns(kind, csv.header);
  ImportReport report;
  host::Transaction unit(db);
  for (const Row& row : csv.rows) {
    auto refuse = [&](const std::string& why) {
      report.refused.push_back("ligne " + std::to_string(row.line) + " : " + why);
    };
    if (!row.error.empty()) {
      refuse(row.error);
      continue;
    }
    if (row.fields.size() != csv.header.size()) {
      refuse(std::to_string(row.fields.size()) + " champs pour " + std::to_string(csv.header.size()) +
             " colonnes d'en-tête");
      continue;
    }
    Values v;
    std::optional<std::string> why;
    for (const auto& [column, index] : at) {
      v[column] = row.fields[index];
      if (auto flaw = host::text::flaw(v[column])) why = column + " : " + *flaw;
    }
    if (!why) why = kind == ImportKind::rates ? checkRate(db, v) : checkAccount(db, kind, v);
    if (why) {
      refuse(*why);
      continue;
    }
    write(db, kind, v);
    ++report.written;
  }
  if (!report.refused.empty() && !skipBad) {
    report.written = 0;
    return report;
  }
  unit.commit();
  return report;
}

}  // namespace app
