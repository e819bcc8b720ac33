#include "host/table.h"

#include <map>

#include "host/automate.h"
#include "host/error.h"
#include "host/session.h"
#include "host/snapshot.h"

namespace host {

namespace {

// Upper bound of every text that begins with a prefix: the prefix followed by the
// last Unicode character.
const char kAfterAll[] = "\xF4\x8F\xBF\xBF";

// Memory images are temporary tables of a session's own connection, and a session
// lives on one thread (several sessions of one process each have theirs): the count
// and the map below are the thread's.
thread_local long long memoryImageCounter = 0;

// Memory images open on this thread: (owner, image name) -> physical table and
// the number of bindings on it. The last binding to go drops the table.
struct SharedImage {
  std::string physical;
  int bindings = 0;
};
std::map<std::pair<const Automate*, std::string>, SharedImage>& sharedImages() {
  thread_local std::map<std::pair<const Automate*, std::string>, SharedImage> images;
  return images;
}

}  // namespace

Table::Table(Automate* owner, const char*, const char* name, const char* alias, void*, void*, int, int)
    : owner_(owner), name_(name ? name : ""), alias_(alias ? alias : "") {
  if (owner_) owner_->declarerTable(this);
}

Table::~Table() {
  if (owner_) owner_->oublierTable(this);
  if (private_copy_ && db_ && name_.rfind("MEM:", 0) == 0) {
    if (owner_) {
      auto it = sharedImages().find({owner_, name_});
      if (it != sharedImages().end() && --it->second.bindings > 0) return;
      if (it != sharedImages().end()) sharedImages().erase(it);
    }
    try {
      db_->libererCopiePrivee(physical_);
    } catch (...) {
      // The connection is going away with the session; nothing left to keep.
    }
  }
}

void Table::renommer(const std::string& name) {
  if (name == name_) return;
  if (db_) throw HostError("la table « " + name_ + " » est déjà ouverte");
  name_ = name;
}

void Table::open() {
  if (db_) return;
  if (name_.empty()) throw HostError("table principale sans nom");
  Session& session = Session::courante();
  db_ = &session.base();
  if (name_.rfind("MEM:", 0) == 0) {
    SharedImage* shared = owner_ ? &sharedImages()[{owner_, name_}] : nullptr;
    if (shared && shared->bindings > 0) {
      physical_ = shared->physical;
    } else if (std::optional<std::string> spare = db_->reprendreCopiePrivee(name_.substr(4))) {
      physical_ = *spare;
      if (shared) shared->physical = physical_;
    } else {
      physical_ = name_ + "#" + std::to_string(++memoryImageCounter);
      db_->creerCopiePrivee(name_.substr(4), physical_);
      if (shared) shared->physical = physical_;
    }
    if (shared) ++shared->bindings;
    private_copy_ = true;
  } else {
    physical_ = name_;
    if (estTableDeTravail(name_)) session.tableDeTravail(name_);
  }
  checked_ = !private_copy_ && !estTableDeTravail(name_);
  columns_ = &db_->colonnes(physical_);
  buffer_.clear();
  for (const auto& c : *columns_) buffer_.push_back(Valeur::vide(c.genre));
  for (const auto& c : *columns_)
    if (c.key) order_.push_back(c.name);
}

const std::vector<Colonne>& Table::colonnes() {
  open();
  return *columns_;
}

std::size_t Table::index(const std::string& column) {
  open();
  for (std::size_t i = 0; i < columns_->size(); ++i)
    if ((*columns_)[i].name == column) return i;
  throw HostError("champ « " + column + " » inconnu de la table « " + name_ + " »");
}

Valeur& Table::slot(std::size_t i) { return buffer_[i]; }

Valeur Table::valeur(const std::string& column) { return buffer_[index(column)]; }

void Table::affecter(const std::string& column, const Valeur& v) {
  std::size_t i = index(column);
  buffer_[i] = v.vers((*columns_)[i].genre, alias() + "." + column);
}

std::string Table::sqlName() const { return quoteIdent(physical_); }

// ---------------------------------------------------------------------------- request

void Table::initRequete() {
  open();
  filters_.clear();
  active_ = false;
  request_text_.reset();
}

void Table::ajouteFiltre(Champ& field, char op, const Valeur& value, char) {
  std::size_t i = index(field.nom());
  if (std::string("=#+-/?").find(op) == std::string::npos)
    throw HostError(std::string("opérateur de filtre « ") + op + " » inconnu");
  Genre genre = (*columns_)[i].genre;
  // Prefix and letter filters compare text; the others compare values of the field's kind.
  Valeur v = (op == '/' || op == '?') ? Valeur::texte(value.vers(Genre::Texte).chaine())
                                      : value.vers(genre, alias() + "." + field.nom());
  filters_.push_back({field.nom(), op, v});
}

void Table::ajouteFiltre(Champ& field, char op, const Donnee& value, char join) {
  ajouteFiltre(field, op, value.valeur(), join);
}
void Table::ajouteFiltre(Champ& field, char op, std::string_view value, char join) {
  ajouteFiltre(field, op, Valeur::texte(std::string(value)), join);
}
void Table::ajouteFiltre(Champ& field, char op, const char* value, char join) {
  ajouteFiltre(field, op, Valeur::texte(value), join);
}

void Table::choisitIndex(const char* name, char) {
  open();
  std::vector<std::string> columns = db_->colonnesIndex(name_, name);
  if (columns.empty()) {
    index(name);  // throws for an unknown name
    columns.push_back(name);
  }
  order_ = columns;
}

void Table::activeRequete() {
  open();
  active_ = true;
}

std::string Table::where(bool forText, const std::string& seekColumn) const {
  std::string sql;
  int n = 0;
  for (const auto& f : filters_) {
    sql += n++ ? (forText ? " And " : " AND ") : (forText ? " Where " : " WHERE ");
    std::string column = quoteIdent(f.column);
    // SQLite seeks an index with one lower bound per column: on the column a position
    // starts with, the position is the tighter one, so the filter's own is written
    // +COLUMN and only checked row by row.
    std::string lower = f.column == seekColumn ? "+" + column : column;
    if (forText) {
      std::string value = f.value.stockage();
      switch (f.op) {
        case '=': sql += f.column + " = " + quoteText(value); break;
        case '#': sql += f.column + " <> " + quoteText(value); break;
        case '+': sql += f.column + " >= " + quoteText(value); break;
        case '-': sql += f.column + " <= " + quoteText(value); break;
        case '/': sql += f.column + " GLOB " + quoteText(value + "*"); break;
        case '?': sql += f.column + " GLOB " + quoteText("*" + value + "*"); break;
      }
      continue;
    }
    switch (f.op) {
      case '=': sql += column + " = ?"; break;
      case '#': sql += column + " <> ?"; break;
      case '+': sql += lower + " >= ?"; break;
      case '-': sql += column + " <= ?"; break;
      case '/': sql += "(" + lower + " >= ? AND " + column + " < ?)"; break;
      case '?': sql += "instr(" + column + ", ?) > 0"; break;
    }
  }
  return sql;
}

void Table::bindFilters(Statement& s, int& next) const {
  for (const auto& f : filters_) {
    if (f.op == '/') {
      std::string prefix = f.value.chaine();
      s.bind(next++, prefix);
      s.bind(next++, prefix + kAfterAll);
    } else {
      s.bind(next++, f.value);
    }
  }
}

std::string Table::orderBy() const {
  std::string sql;
  for (const auto& c : order_) sql += (sql.empty() ? "" : ", ") + quoteIdent(c);
  return sql.empty() ? "rowid" : sql + ", rowid";
}

std::string Table::requete() {
  open();
  if (request_text_) return *request_text_;
  std::string sql = "Select * From " + quoteIdent(name_) + where(true);
  std::string order;
  for (const auto& c : order_) order += (order.empty() ? "" : ", ") + c;
  if (!order.empty()) sql += " Order By " + order;
  return sql;
}

// ---------------------------------------------------------------------------- reading

void Table::load(Statement& s) {
  for (std::size_t i = 0; i < columns_->size(); ++i) {
    Genre genre = (*columns_)[i].genre;
    int c = static_cast<int>(i);
    if (s.isNull(c))
      buffer_[i] = Valeur::vide(genre);
    else if (genre == Genre::Entier)
      buffer_[i] = Valeur::entier(s.integer(c));
    else if (genre == Genre::Double)
      buffer_[i] = Valeur::reel(s.real(c));
    else
      buffer_[i] = Valeur::depuisTexte(genre, s.text(c), alias() + "." + (*columns_)[i].name);
  }
  rowid_ = s.integer(static_cast<int>(columns_->size()));
  if (checked_) as_read_ = s.empreinte(static_cast<int>(columns_->size()));
}

int Table::lit(int, Champ& field, char op, const Valeur& value) {
  std::size_t i = index(field.nom());
  if (op != '=') throw HostError(std::string("lecture avec l'opérateur « ") + op + " » non prévue");
  Statement& s = db_->prepare("SELECT *, rowid FROM " + sqlName() + " WHERE " + quoteIdent(field.nom()) +
                              " = ? ORDER BY " + orderBy() + " LIMIT 1");
  s.bind(1, value.vers((*columns_)[i].genre, alias() + "." + field.nom()));
  bool found = s.step();
  if (found) load(s);
  s.reset();
  return found ? 0 : 100;
}

int Table::lit(int mode, Champ& field, char op, const Donnee& value) { return lit(mode, field, op, value.valeur()); }
int Table::lit(int mode, Champ& field, char op, std::string_view value) {
  return lit(mode, field, op, Valeur::texte(std::string(value)));
}
int Table::lit(int mode, Champ& field, char op, const char* value) {
  return lit(mode, field, op, Valeur::texte(value));
}

int Table::suivant(int mode, char) {
  open();
  if (!active_) throw HostError("requête de « " + alias() + " » non activée");
  bool after = mode == 1 && rowid_.has_value();
  // The position is the current row's key in the request's order. A column that a
  // filter holds equal is the same on every row of the request, so it is left out:
  // the rest then follows the equality prefix of the index, and SQLite seeks straight
  // to the next row instead of walking again from the first row of the request.
  std::vector<std::string> position;
  if (after)
    for (const auto& c : order_) {
      bool heldEqual = false;
      for (const auto& f : filters_) heldEqual = heldEqual || (f.column == c && f.op == '=');
      if (!heldEqual) position.push_back(c);
    }
  std::string sql = "SELECT *, rowid FROM " + sqlName() + where(false, position.empty() ? "" : position.front());
  if (after) {
    std::string keys, marks;
    for (const auto& c : position) {
      keys += quoteIdent(c) + ", ";
      marks += "?, ";
    }
    sql += std::string(filters_.empty() ? " WHERE " : " AND ") + "(" + keys + "rowid) > (" + marks + "?)";
  }
  sql += " ORDER BY " + orderBy() + " LIMIT 1";
  Statement& s = db_->prepare(sql);
  int next = 1;
  bindFilters(s, next);
  if (after) {
    for (const auto& c : position) s.bind(next++, buffer_[index(c)]);
    s.bind(next++, *rowid_);
  }
  bool found = s.step();
  if (found) load(s);
  s.reset();
  return found ? 0 : 100;
}

void Table::replacer(const Position& p) {
  open();
  buffer_ = p.buffer;
  rowid_ = p.rowid;
  as_read_ = p.asRead;
}

long long Table::nombre() {
  open();
  Statement& s = db_->prepare("SELECT count(*) FROM " + sqlName() + where(false));
  int next = 1;
  bindFilters(s, next);
  s.step();
  long long n = s.integer(0);
  s.reset();
  return n;
}

// ---------------------------------------------------------------------------- writing

void Table::raz(char) {
  open();
  for (std::size_t i = 0; i < columns_->size(); ++i) buffer_[i] = Valeur::vide((*columns_)[i].genre);
  rowid_.reset();
}

std::string Table::columnHash() const {
  std::string sql = "empreinte_ligne(";
  for (std::size_t i = 0; i < columns_->size(); ++i) sql += (i ? ", " : "") + quoteIdent((*columns_)[i].name);
  return sql + ")";
}

void Table::changedMeanwhile() {
  std::string key;
  for (std::size_t i = 0; i < columns_->size(); ++i)
    if ((*columns_)[i].key) key += (key.empty() ? "" : " ") + buffer_[i].chaine();
  throw HostError("La fiche « " + key + " » de « " + name_ +
                  " » a été modifiée ou supprimée par un autre utilisateur depuis que vous l'avez lue : "
                  "rien n'est enregistré.@Fermez-la puis rouvrez-la pour voir son état actuel.");
}

void Table::ecrit() {
  open();
  std::string sql;
  if (rowid_) {
    sql = "UPDATE " + sqlName() + " SET ";
    for (std::size_t i = 0; i < columns_->size(); ++i)
      sql += (i ? ", " : "") + quoteIdent((*columns_)[i].name) + " = ?";
    sql += " WHERE rowid = ?";
    if (checked_) sql += " AND " + columnHash() + " = ?";
  } else {
    std::string names, marks;
    for (std::size_t i = 0; i < columns_->size(); ++i) {
      names += (i ? ", " : "") + quoteIdent((*columns_)[i].name);
      marks += i ? ", ?" : "?";
    }
    sql = "INSERT INTO " + sqlName() + " (" + names + ") VALUES (" + marks + ")";
  }
  sql += " RETURNING rowid";
  if (checked_) sql += ", " + columnHash();
  Statement& s = db_->prepare(sql);
  int next = 1;
  for (std::size_t i = 0; i < columns_->size(); ++i) s.bind(next++, buffer_[i]);
  if (rowid_) {
    s.bind(next++, *rowid_);
    if (checked_) s.bind(next++, as_read_);
  }
  bool written;
  try {
    written = s.step();
  } catch (const HostError& e) {
    throw HostError("écriture dans « " + alias() + " » refusée : " + e.what());
  }
  if (!written) changedMeanwhile();
  rowid_ = s.integer(0);
  if (checked_) as_read_ = s.integer(1);
  s.reset();
}

void Table::supprime() {
  open();
  if (!rowid_) throw HostError("aucun enregistrement courant à supprimer dans « " + alias() + " »");
  std::string sql = "DELETE FROM " + sqlName() + " WHERE rowid = ?";
  if (checked_) sql += " AND " + columnHash() + " = ?";
  Statement& s = db_->prepare(sql);
  s.bind(1, *rowid_);
  if (checked_) s.bind(2, as_read_);
  s.step();
  s.reset();
  if (db_->changements() == 0) changedMeanwhile();
}

void Table::vide() {
  open();
  Statement& s = db_->prepare("DELETE FROM " + sqlName() + where(false));
  int next = 1;
  bindFilters(s, next);
  s.step();
  s.reset();
  rowid_.reset();
}

void Table::keepState(Snapshot& snapshot) {
  snapshot.keep(filters_, active_, request_text_);
  if (db_) {
    snapshot.keep(buffer_, rowid_, as_read_, order_);
    return;
  }
  // Opened during the action: what it read then belongs to the undone action.
  snapshot.add([this] {
    if (!db_) return;
    for (std::size_t i = 0; i < columns_->size(); ++i) buffer_[i] = Valeur::vide((*columns_)[i].genre);
    rowid_.reset();
  });
}

void Table::copier(Table& from) {
  open();
  from.open();
  for (std::size_t i = 0; i < columns_->size(); ++i) {
    const std::string& name = (*columns_)[i].name;
    for (std::size_t j = 0; j < from.columns_->size(); ++j)
      if ((*from.columns_)[j].name == name) buffer_[i] = from.buffer_[j].vers((*columns_)[i].genre, name);
  }
}

// ---------------------------------------------------------------------------- Champ

Champ::Champ(Automate*, const char* field, Table* table, int) : Champ(field, table) {}

Champ::Champ(const char* field, Table* table, int) : Donnee(Genre::Texte, field, "", "", 0, nullptr), table_(table) {
  if (!table_) throw HostError(std::string("champ « ") + (field ? field : "") + " » sans table");
}

Genre Champ::genre() const {
  Table& t = *table_;
  return t.colonnes()[t.index(nom())].genre;
}

Valeur Champ::lire() const { return table_->buffer_[table_->index(nom())]; }

void Champ::ecrire(Valeur v) { table_->buffer_[table_->index(nom())] = std::move(v); }

}  // namespace host
