#include "host/database.h"

#include <sqlite3.h>

#include <cerrno>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <algorithm>
#include <filesystem>

#include "host/error.h"

namespace host {

std::string quoteIdent(std::string_view name) {
  std::string out = "\"";
  for (char c : name) {
    if (c == '"') out += '"';
    out += c;
  }
  return out + "\"";
}

std::string quoteText(std::string_view text) {
  std::string out = "'";
  for (char c : text) {
    if (c == '\'') out += '\'';
    out += c;
  }
  return out + "'";
}

namespace {

// How long a unit of work waits for another process's unit to end.
constexpr int kBusySeconds = 10;

[[noreturn]] void fail(sqlite3* db, std::string_view what) {
  throw HostError(std::string(what) + " : " + (db ? sqlite3_errmsg(db) : "base inaccessible"));
}

Genre genreOf(const std::string& declared) {
  std::string first = declared.substr(0, declared.find(' '));
  if (first == "DATE") return Genre::Date;
  if (first == "MONEY") return Genre::Monnaie;
  if (first == "RATE" || first == "REAL") return Genre::Double;
  if (first == "INTEGER") return Genre::Entier;
  return Genre::Texte;
}

// What a statement that found the dossier busy means (nothing when it did not).
void failIfBusy(sqlite3* db, int rc) {
  if ((rc & 0xFF) != SQLITE_BUSY) return;
  // A unit that began by reading cannot wait for the write lock (SQLite gives up at
  // once rather than risk two units waiting on each other), nor write once another
  // process has written since it began: it starts again from a fresh reading.
  if (!sqlite3_get_autocommit(db) && sqlite3_txn_state(db, "main") != SQLITE_TXN_WRITE) throw UniteARecommencer{};
  throw HostError("le dossier est occupé par un autre utilisateur depuis plus de " + std::to_string(kBusySeconds) +
                  " secondes ; "
                  "rien n'est enregistré, réessayez dans un instant");
}

void rowHashFunction(sqlite3_context* context, int count, sqlite3_value** values) {
  sqlite3_result_int64(context, empreinteLigne(values, count));
}

// Words for the system errors a person can act on; nothing for the others.
std::optional<std::string> knownSystemReason(int error) {
  switch (error) {
    case ENOSPC:
    case EDQUOT: return "le disque est plein";
    case EROFS: return "le fichier ou son système de fichiers est en lecture seule";
    case EACCES:
    case EPERM: return "les droits du fichier ou de son répertoire ne le permettent pas";
    default: return std::nullopt;
  }
}

// Why a dossier's file cannot be used: a lock from SQLite's extended result code, a
// failure of the file from the system's error number when SQLite kept one (or from the
// code when it did not); nothing when neither says more than SQLite's own message.
std::optional<std::string> reasonOf(int code, int systemError) {
  switch (code & 0xFF) {
    case SQLITE_BUSY:
    case SQLITE_LOCKED:
      return "il est verrouillé par un autre programme, qui ne l'a pas libéré en " + std::to_string(kBusySeconds) +
             " secondes";
    case SQLITE_FULL: return knownSystemReason(ENOSPC);
    default: break;
  }
  if (auto known = knownSystemReason(systemError)) return known;
  if ((code & 0xFF) == SQLITE_READONLY) return knownSystemReason(EROFS);
  return std::nullopt;
}

// SQLite's message for the failure just met, unless the disk is full: that one is
// said in words a person can act on.
std::string failureText(sqlite3* db, const char* message) {
  int code = sqlite3_extended_errcode(db) & 0xFF;
  if (code == SQLITE_FULL || (code == SQLITE_IOERR && sqlite3_system_errno(db) == ENOSPC))
    return *knownSystemReason(ENOSPC);
  return message ? message : sqlite3_errmsg(db);
}

[[noreturn]] void unusable(const std::string& path, sqlite3* db, int code) {
  if ((code & 0xFF) == SQLITE_NOTADB) throw HostError("« " + path + " » n'est pas un dossier");
  std::string reason = reasonOf(code, db ? sqlite3_system_errno(db) : 0)
                           .value_or(db ? sqlite3_errmsg(db) : "échec d'ouverture");
  throw HostError("le dossier « " + path + " » ne peut être ouvert : " + reason);
}

sqlite3* openFile(const std::string& path, int flags) {
  sqlite3* db = nullptr;
  int rc = sqlite3_open_v2(path.c_str(), &db, flags, nullptr);
  if (rc != SQLITE_OK) {
    std::unique_ptr<sqlite3, int (*)(sqlite3*)> closing(db, sqlite3_close);
    unusable(path, db, db ? sqlite3_extended_errcode(db) : rc);
  }
  sqlite3_busy_timeout(db, kBusySeconds * 1000);
  sqlite3_extended_result_codes(db, 1);
  sqlite3_create_function(db, "empreinte_ligne", -1, SQLITE_UTF8 | SQLITE_DETERMINISTIC, nullptr, rowHashFunction,
                          nullptr, nullptr);
  return db;
}

}  // namespace

long long empreinteLigne(sqlite3_value** values, int count) {
  // FNV-1a over each value's type and bytes; a value's type is read before anything
  // else, and no accessor used here converts a value to another type.
  std::uint64_t hash = 14695981039346656037ull;
  auto mix = [&hash](const void* data, std::size_t size) {
    const auto* bytes = static_cast<const unsigned char*>(data);
    for (std::size_t i = 0; i < size; ++i) hash = (hash ^ bytes[i]) * 1099511628211ull;
  };
  for (int i = 0; i < count; ++i) {
    unsigned char type = static_cast<unsigned char>(sqlite3_value_type(values[i]));
    mix(&type, 1);
    switch (type) {
      case SQLITE_INTEGER: {
        sqlite3_int64 n = sqlite3_value_int64(values[i]);
        mix(&n, sizeof n);
        break;
      }
      case SQLITE_FLOAT: {
        double d = sqlite3_value_double(values[i]);
        mix(&d, sizeof d);
        break;
      }
      case SQLITE_TEXT: {
        const unsigned char* text = sqlite3_value_text(values[i]);
        mix(text, static_cast<std::size_t>(sqlite3_value_bytes(values[i])));
        break;
      }
      case SQLITE_BLOB: {
        const void* blob = sqlite3_value_blob(values[i]);
        mix(blob, static_cast<std::size_t>(sqlite3_value_bytes(values[i])));
        break;
      }
      default: break;
    }
    unsigned char end = 0xFF;  // so that ("ab", "c") and ("a", "bc") differ
    mix(&end, 1);
  }
  return static_cast<long long>(hash);
}

std::string systemReason(int error) { return knownSystemReason(error).value_or(std::strerror(error)); }

// ---------------------------------------------------------------------------- Statement

Statement& Statement::bind(int index, std::string_view text) {
  if (sqlite3_bind_text(stmt_, index, text.data(), static_cast<int>(text.size()), SQLITE_TRANSIENT) != SQLITE_OK)
    fail(db_, "liaison d'une valeur");
  return *this;
}

Statement& Statement::bind(int index, long long n) {
  if (sqlite3_bind_int64(stmt_, index, n) != SQLITE_OK) fail(db_, "liaison d'une valeur");
  return *this;
}

Statement& Statement::bind(int index, double d) {
  if (sqlite3_bind_double(stmt_, index, d) != SQLITE_OK) fail(db_, "liaison d'une valeur");
  return *this;
}

Statement& Statement::bind(int index, const Valeur& v) {
  switch (v.genre()) {
    case Genre::Entier: return bind(index, v.entier());
    case Genre::Double:
    case Genre::Simple: return bind(index, v.reel());
    default: return bind(index, std::string_view(v.stockage()));
  }
}

namespace {

// Fault trials: with MIRVAE_FAULT_KILL_AT_WRITE=N in its environment, the process
// dies at once, as under kill -9, before its N-th statement that writes a row, so
// that tests can stop it between any two writes.
void dieBeforeWriteIfAsked(sqlite3_stmt* stmt) {
  static const long long at = [] {
    const char* text = std::getenv("MIRVAE_FAULT_KILL_AT_WRITE");
    return text ? std::atoll(text) : 0LL;
  }();
  static long long writes = 0;
  if (at > 0 && !sqlite3_stmt_readonly(stmt) && ++writes == at) std::_Exit(137);
}

}  // namespace

bool Statement::step() {
  dieBeforeWriteIfAsked(stmt_);
  int rc = sqlite3_step(stmt_);
  if (rc == SQLITE_ROW) return true;
  if (rc == SQLITE_DONE) return false;
  std::string message = failureText(db_, nullptr);
  sqlite3_reset(stmt_);
  failIfBusy(db_, rc);
  throw HostError("base de données : " + message);
}

void Statement::reset() {
  sqlite3_reset(stmt_);
  sqlite3_clear_bindings(stmt_);
}

int Statement::columnCount() const { return sqlite3_column_count(stmt_); }

std::string Statement::columnName(int column) const {
  const char* name = sqlite3_column_name(stmt_, column);
  return name ? name : "";
}

std::string Statement::text(int column) const {
  const unsigned char* p = sqlite3_column_text(stmt_, column);
  return p ? std::string(reinterpret_cast<const char*>(p), static_cast<std::size_t>(sqlite3_column_bytes(stmt_, column)))
           : std::string();
}

long long Statement::integer(int column) const { return sqlite3_column_int64(stmt_, column); }
double Statement::real(int column) const { return sqlite3_column_double(stmt_, column); }
bool Statement::isNull(int column) const { return sqlite3_column_type(stmt_, column) == SQLITE_NULL; }

long long Statement::empreinte(int count) const {
  std::vector<sqlite3_value*> values(static_cast<std::size_t>(count));
  for (int i = 0; i < count; ++i) values[static_cast<std::size_t>(i)] = sqlite3_column_value(stmt_, i);
  return empreinteLigne(values.data(), count);
}

// ---------------------------------------------------------------------------- Database

std::unique_ptr<Database> Database::creer(const std::string& path) {
  sqlite3* db = openFile(path, SQLITE_OPEN_READWRITE | SQLITE_OPEN_CREATE);
  auto result = std::unique_ptr<Database>(new Database(db, path));
  result->exec("PRAGMA foreign_keys = ON");
  return result;
}

std::unique_ptr<Database> Database::ouvrir(const std::string& path, const std::vector<MiseANiveau>& upgrades) {
  if (!std::filesystem::exists(path)) throw HostError("dossier « " + path + " » introuvable");
  if (!std::filesystem::is_regular_file(path)) throw HostError("« " + path + " » n'est pas un dossier");
  sqlite3* db = openFile(path, SQLITE_OPEN_READWRITE);
  auto result = std::unique_ptr<Database>(new Database(db, path));
  // SQLite opens a file it may not write read-only, without a word: every action
  // would then fail at its first write.
  if (sqlite3_db_readonly(db, "main") == 1) unusable(path, db, SQLITE_READONLY);
  // The first read of the file tells a locked, unreadable or foreign file apart.
  sqlite3_stmt* raw = nullptr;
  int rc = sqlite3_prepare_v2(db, "SELECT VALEUR FROM DOSSIER_INFO WHERE CLE = 'schema_version'", -1, &raw, nullptr);
  std::unique_ptr<sqlite3_stmt, int (*)(sqlite3_stmt*)> query(raw, sqlite3_finalize);
  if (rc == SQLITE_OK) rc = sqlite3_step(raw);
  std::string version;
  if (rc == SQLITE_ROW) {
    const unsigned char* text = sqlite3_column_text(raw, 0);
    version = text ? reinterpret_cast<const char*>(text) : "";
  } else if (rc != SQLITE_DONE) {
    int code = sqlite3_extended_errcode(db);
    // A database of another program: readable, but without the dossier's own table.
    if (code == SQLITE_ERROR) throw HostError("« " + path + " » n'est pas un dossier");
    unusable(path, db, code);
  }
  query.reset();
  if (sqlite3_exec(db, "PRAGMA journal_mode = WAL; PRAGMA synchronous = NORMAL", nullptr, nullptr, nullptr) !=
      SQLITE_OK)
    unusable(path, db, sqlite3_extended_errcode(db));
  for (;;) {
    if (version == kSchemaVersion) return result;
    auto step = std::find_if(upgrades.begin(), upgrades.end(), [&](const MiseANiveau& u) { return u.from == version; });
    if (step == upgrades.end())
      throw HostError("le dossier « " + path + " » est de la version " + (version.empty() ? "?" : version) +
                      " du schéma ; ce programme lit la version " + kSchemaVersion);
    try {
      result->begin();
      result->exec(step->sql);
      Statement& mark = result->prepare("UPDATE DOSSIER_INFO SET VALEUR = ? WHERE CLE = 'schema_version'");
      mark.bind(1, step->to);
      mark.step();
      mark.reset();
      result->commit();
    } catch (const HostError& e) {
      result->rollback();
      throw HostError("le dossier « " + path + " » n'a pu être mis à la version " + step->to + " du schéma : " +
                      e.what());
    }
    version = step->to;
  }
}

Database::~Database() {
  wrappers_.clear();
  statements_.clear();
  sqlite3_close(db_);
}

void Database::exec(std::string_view sql) {
  char* error = nullptr;
  std::string text(sql);
  if (int rc = sqlite3_exec(db_, text.c_str(), nullptr, nullptr, &error); rc != SQLITE_OK) {
    std::string message = failureText(db_, error ? error : "erreur");
    sqlite3_free(error);
    failIfBusy(db_, rc);
    throw HostError("base de données : " + message);
  }
}

Statement& Database::prepare(const std::string& sql) {
  auto it = wrappers_.find(sql);
  if (it != wrappers_.end()) {
    it->second.reset();
    return it->second;
  }
  sqlite3_stmt* stmt = nullptr;
  if (sqlite3_prepare_v2(db_, sql.c_str(), static_cast<int>(sql.size()), &stmt, nullptr) != SQLITE_OK)
    fail(db_, "requête « " + sql + " »");
  statements_.emplace(sql, std::unique_ptr<sqlite3_stmt, void (*)(sqlite3_stmt*)>(
                               stmt, [](sqlite3_stmt* s) { sqlite3_finalize(s); }));
  return wrappers_.emplace(sql, Statement(db_, stmt)).first->second;
}

void Database::begin(Verrou verrou, Sync sync) {
  if (depth_ == 0) {
    run(verrou == Verrou::immediat ? "BEGIN IMMEDIATE" : "BEGIN DEFERRED");
    forced_ = sync == Sync::forced;
  }
  ++depth_;
}

bool Database::ecritureEnCours() const { return sqlite3_txn_state(db_, "main") == SQLITE_TXN_WRITE; }

int Database::changements() const { return sqlite3_changes(db_); }

void Database::commit() {
  if (depth_ == 0) return;
  if (--depth_ > 0) return;
  bool wrote = ecritureEnCours();
  run("COMMIT");
  if (forced_ && wrote) syncLog();
}

// Puts the write-ahead log on the disk: every unit committed so far survives a power
// cut. The commit itself is done; a disk that refuses is reported, so that nobody is
// told an operation is kept when it may not be.
void Database::syncLog() {
  sqlite3_file* log = nullptr;
  if (sqlite3_file_control(db_, "main", SQLITE_FCNTL_JOURNAL_POINTER, &log) != SQLITE_OK || !log || !log->pMethods)
    return;
  if (int rc = log->pMethods->xSync(log, SQLITE_SYNC_NORMAL); rc != SQLITE_OK)
    throw NonGarde("le disque n'a pas confirmé l'écriture du dossier (" + std::string(sqlite3_errstr(rc)) +
                    ") : ce qui vient d'être enregistré peut ne pas survivre à une coupure de courant");
  ++forced_writes_;
}

void Database::run(const std::string& sql) {
  Statement& s = prepare(sql);
  s.step();
  s.reset();
}

void Database::rollback() {
  if (depth_ == 0) return;
  depth_ = 0;
  for (auto& [sql, s] : wrappers_) s.reset();
  exec("ROLLBACK");
  // Private copies made during the unit went with it; their owners still hold
  // bindings on them, so they come back, empty.
  for (const auto& [name, model] : private_copies_)
    if (!existe(name)) creerCopiePrivee(model, name);
  // A copy given back during the unit got its rows back with it.
  for (const auto& [model, name] : spare_copies_) emptyCopy(name);
}

const std::vector<Colonne>& Database::colonnes(const std::string& table) {
  auto it = columns_.find(table);
  if (it != columns_.end()) return it->second;
  std::vector<Colonne> columns;
  sqlite3_stmt* stmt = nullptr;
  std::string sql = "PRAGMA table_info(" + quoteIdent(table) + ")";
  if (sqlite3_prepare_v2(db_, sql.c_str(), -1, &stmt, nullptr) != SQLITE_OK) fail(db_, sql);
  while (sqlite3_step(stmt) == SQLITE_ROW) {
    std::string name = reinterpret_cast<const char*>(sqlite3_column_text(stmt, 1));
    const unsigned char* type = sqlite3_column_text(stmt, 2);
    columns.push_back({name, genreOf(type ? reinterpret_cast<const char*>(type) : ""), sqlite3_column_int(stmt, 5) > 0});
  }
  sqlite3_finalize(stmt);
  if (columns.empty()) throw HostError("table « " + table + " » inconnue du dictionnaire");
  return columns_.emplace(table, std::move(columns)).first->second;
}

std::vector<std::string> Database::colonnesIndex(const std::string& table, const std::string& index) {
  auto known = index_columns_.find({table, index});
  if (known != index_columns_.end()) return known->second;
  std::vector<std::string> names;
  sqlite3_stmt* stmt = nullptr;
  std::string sql = "SELECT name FROM pragma_index_info(?) ORDER BY seqno";
  if (sqlite3_prepare_v2(db_, sql.c_str(), -1, &stmt, nullptr) != SQLITE_OK) fail(db_, sql);
  std::string full = table + "_" + index;
  sqlite3_bind_text(stmt, 1, full.c_str(), -1, SQLITE_TRANSIENT);
  while (sqlite3_step(stmt) == SQLITE_ROW) names.emplace_back(reinterpret_cast<const char*>(sqlite3_column_text(stmt, 0)));
  sqlite3_finalize(stmt);
  index_columns_.emplace(std::make_pair(table, index), names);
  return names;
}

bool Database::existe(const std::string& table) {
  Statement& s = prepare("SELECT 1 FROM sqlite_schema WHERE type = 'table' AND name = ? UNION ALL "
                         "SELECT 1 FROM sqlite_temp_schema WHERE type = 'table' AND name = ?");
  s.bind(1, table).bind(2, table);
  bool found = s.step();
  s.reset();
  return found;
}

void Database::creerCopiePrivee(const std::string& model, const std::string& name) {
  Statement& s = prepare("SELECT sql FROM main.sqlite_schema WHERE type = 'table' AND name = ?");
  s.bind(1, model);
  if (!s.step()) throw HostError("table « " + model + " » inconnue du dictionnaire");
  std::string sql = s.text(0);
  s.reset();
  std::size_t open = sql.find('(');
  // The columns stay cached: bindings hold on to them, and a copy made again (after
  // a rollback) has the same ones.
  forgetStatements(name);
  exec("DROP TABLE IF EXISTS temp." + quoteIdent(name));
  exec("CREATE TEMP TABLE " + quoteIdent(name) + " " + sql.substr(open));
  private_copies_[name] = model;
}

void Database::supprimerCopiePrivee(const std::string& name) {
  private_copies_.erase(name);
  for (auto it = spare_copies_.begin(); it != spare_copies_.end();)
    it = it->second == name ? spare_copies_.erase(it) : std::next(it);
  forget(name);
  exec("DROP TABLE IF EXISTS temp." + quoteIdent(name));
}

void Database::libererCopiePrivee(const std::string& name) {
  auto copy = private_copies_.find(name);
  if (copy == private_copies_.end()) return;
  emptyCopy(name);
  spare_copies_.emplace(copy->second, name);
}

std::optional<std::string> Database::reprendreCopiePrivee(const std::string& model) {
  auto spare = spare_copies_.find(model);
  if (spare == spare_copies_.end()) return std::nullopt;
  std::string name = spare->second;
  spare_copies_.erase(spare);
  return name;
}

void Database::emptyCopy(const std::string& name) { run("DELETE FROM temp." + quoteIdent(name)); }

void Database::forget(const std::string& table) {
  columns_.erase(table);
  for (auto it = index_columns_.begin(); it != index_columns_.end();)
    it = it->first.first == table ? index_columns_.erase(it) : std::next(it);
  forgetStatements(table);
}

void Database::forgetStatements(const std::string& table) {
  // Statements over a dropped table would fail; drop every cached one that names it.
  for (auto it = wrappers_.begin(); it != wrappers_.end();) {
    if (it->first.find(quoteIdent(table)) != std::string::npos) {
      statements_.erase(it->first);
      it = wrappers_.erase(it);
    } else {
      ++it;
    }
  }
}

}  // namespace host
