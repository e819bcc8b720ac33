#include "model/impetat.h"

#include <sqlite3.h>

#include <cctype>
#include <memory>

#include "host/error.h"
#include "host/session.h"
#include "host/table.h"
#include "model/impression.h"
#include "model/step.h"

namespace model {

namespace {

using Prepared = std::unique_ptr<sqlite3_stmt, int (*)(sqlite3_stmt*)>;

// The request with the word TABLE (the form requests' stand-in for the job's main
// table) replaced by the main table's quoted name.
std::string withMainTable(const std::string& sql, const std::string& table) {
  std::string out;
  auto isWord = [](char c) { return std::isalnum(static_cast<unsigned char>(c)) || c == '_'; };
  bool quoted = false;
  for (std::size_t i = 0; i < sql.size();) {
    char c = sql[i];
    if (c == '\'') quoted = !quoted;
    if (!quoted && sql.compare(i, 5, "TABLE") == 0 && (i == 0 || !isWord(sql[i - 1])) &&
        (i + 5 == sql.size() || !isWord(sql[i + 5]))) {
      out += quoteIdent(table);
      i += 5;
      continue;
    }
    out += c;
    ++i;
  }
  return out;
}

// Prepares `sql` and checks that it is one statement that only reads; errors name
// the request as it was given.
Prepared prepareReading(Database& db, const std::string& sql, const std::string& given) {
  sqlite3_stmt* raw = nullptr;
  const char* tail = nullptr;
  if (sqlite3_prepare_v2(db.brut(), sql.c_str(), -1, &raw, &tail) != SQLITE_OK || !raw) {
    std::string why = sqlite3_errmsg(db.brut());
    sqlite3_finalize(raw);
    throw HostError("requête d'impression illisible (" + why + ") : " + given);
  }
  Prepared stmt(raw, sqlite3_finalize);
  for (; tail && *tail; ++tail)
    if (!std::isspace(static_cast<unsigned char>(*tail)))
      throw HostError("une requête d'impression est une seule instruction : " + given);
  if (!sqlite3_stmt_readonly(raw)) throw HostError("une requête d'impression ne fait que lire : " + given);
  return stmt;
}

// The binding whose rows are the lines of each record: one with a NUMERO column.
Table* lineBinding(Automate& job) {
  for (Table* t : job.tables()) {
    if (t == job.table(false)) continue;
    for (const Colonne& c : t->colonnes())
      if (c.name == "NUMERO") return t;
  }
  return nullptr;
}

std::string firstKey(Table& t) {
  for (const Colonne& c : t.colonnes())
    if (c.key) return c.name;
  throw HostError("la table « " + t.nom() + " » n'a pas de clé");
}

}  // namespace

Impetat::Impetat(Evt* e) : Traitmnt(e) {
  addBaseBranch("DEBUT_FICHE", [this](Evt* ev) { debut_fiche(ev); });
}

void Impetat::applyRequest(const std::string& sql) {
  prepareReading(session().base(), withMainTable(sql, nomTable()), sql);
  request_ = sql;
  table(false)->setRequestText(sql);
}

void Impetat::debut_fiche(Evt*) {}

void Impetat::demarrer() {
  Imprimante::courante().commencer(code(), request_);
  if (step(*this, "DEBUT") != Outcome::accepted) {
    sortir(nullptr, 0);
    return;
  }
  Imprimante::courante().entete(variableValues());
  Table& main = *table(false);
  std::string key = firstKey(main);
  // The keys first: handlers read other tables while each record prints.
  std::vector<Valeur> keys;
  if (request_.empty()) {
    main.initRequete();
    main.activeRequete();
    for (int rc = main.suivant(3); rc == 0; rc = main.suivant(1)) keys.push_back(main.valeur(key));
  } else {
    Prepared stmt = prepareReading(session().base(), withMainTable(request_, nomTable()), request_);
    int column = -1;
    for (int i = 0; i < sqlite3_column_count(stmt.get()); ++i)
      if (key == sqlite3_column_name(stmt.get(), i)) column = i;
    if (column < 0) throw HostError("la requête d'impression ne donne pas le champ « " + key + " » : " + request_);
    int rc;
    while ((rc = sqlite3_step(stmt.get())) == SQLITE_ROW) {
      const unsigned char* text = sqlite3_column_text(stmt.get(), column);
      keys.push_back(Valeur::texte(text ? reinterpret_cast<const char*>(text) : ""));
    }
    if (rc != SQLITE_DONE) throw HostError("requête d'impression en échec : " + request_);
  }
  Champ field(key.c_str(), &main);
  for (const Valeur& k : keys) {
    if (main.lit(3, field, '=', k) != 0) continue;  // gone since the request ran
    printRecord();
    if (stopped(*this)) break;
  }
  Imprimante::courante().terminer();
  sortir(nullptr, 0);
}

void Impetat::printRecord() {
  Table& main = *table(false);
  if (step(*this, "DEBUT_FICHE") == Outcome::stopped) return;
  Table* lines = lineBinding(*this);
  auto body = [this, lines](const std::string& key) {
    for (const char* event : {"LST_DEBUT_FICHE", "LST_DEBUT1_IMPRIME", "LST_CORPS_IMPRIME"})
      if (step(*this, event) == Outcome::stopped) return false;
    print("ligne", key, lines);
    return true;
  };
  std::string ident = main.valeur(firstKey(main)).chaine();
  if (!lines) {
    body(ident);
    return;
  }
  print("fiche", ident, nullptr);
  Champ link("NUMERO", lines);
  lines->initRequete();
  lines->ajouteFiltre(link, '/', ident + "|");
  lines->activeRequete();
  for (int rc = lines->suivant(3); rc == 0; rc = lines->suivant(1))
    if (!body(lines->valeur("NUMERO").chaine())) return;
}

Values Impetat::variableValues() const {
  Values values;
  for (const Donnee* d : variables())
    if (d->acces() == 0) values.emplace_back(d->nom(), d->chaine());
  return values;
}

void Impetat::print(const std::string& kind, const std::string& key, Table* lines) {
  Block block{.kind = kind, .key = key, .values = variableValues()};
  std::string text = kind + " " + key;
  for (const auto& [name, value] : block.values) text += " | " + name + "=" + value;
  for (Table* t : {table(false), lines}) {
    if (!t) continue;
    const std::vector<Colonne>& columns = t->colonnes();
    for (const Colonne& c : columns) block.values.emplace_back(t->nom() + "." + c.name, t->valeur(c.name).chaine());
  }
  Imprimante::courante().ecrire(std::move(text), std::move(block));
}

void Edition_etat2::debut(Evt*) {}

}  // namespace model
