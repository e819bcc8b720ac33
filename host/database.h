// The one narrow door to the database. Everything above it (tables, services,
// the ledger) speaks through Database and Statement, so that another engine can
// be put behind them without touching the library.
//
// A dossier is one SQLite file. Several processes may open it at once: each unit
// of work takes the write lock when it begins (BEGIN IMMEDIATE) and waits up to
// the busy timeout for another process to finish its own, so units never
// interleave and a unit is kept whole or not at all.
#pragma once

#include <map>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "host/error.h"
#include "host/value.h"

struct sqlite3;
struct sqlite3_stmt;
struct sqlite3_value;

namespace host {

struct Colonne {
  std::string name;
  Genre genre;
  bool key;  // part of the primary key
};

// Thrown by a statement of a deferred unit that can no longer take the write lock
// because another process wrote since the unit began reading. Not a HostError: no
// handler's trap takes it; it goes up to whoever runs the unit, which rolls it back
// and plays it again.
struct UniteARecommencer {};

// Hash of a row's stored values (type and bytes of each), the same whether SQLite or
// the program computes it: a binding keeps it for the row it read, and writes back
// only if the row still has it. In SQL: empreinte_ligne(col1, col2, ...).
long long empreinteLigne(sqlite3_value** values, int count);

class Statement {
 public:
  Statement(sqlite3* db, sqlite3_stmt* stmt) : db_(db), stmt_(stmt) {}
  // Values are always bound, never pasted into SQL text.
  Statement& bind(int index, std::string_view text);
  Statement& bind(int index, long long n);
  Statement& bind(int index, double d);
  Statement& bind(int index, const Valeur& v);
  // True while a row is there; throws HostError on failure.
  bool step();
  void reset();
  int columnCount() const;
  std::string columnName(int column) const;
  std::string text(int column) const;
  long long integer(int column) const;
  double real(int column) const;
  bool isNull(int column) const;
  // empreinteLigne of the first `count` columns of the current row.
  long long empreinte(int count) const;

 private:
  sqlite3* db_;
  sqlite3_stmt* stmt_;
};

class Database {
 public:
  static constexpr const char* kSchemaVersion = "2";

  // Opens an existing dossier for reading and writing. Throws HostError saying what
  // happened: the file is missing, is not a dossier, has another schema version, is
  // locked by another process beyond the wait of a unit of work, cannot be written
  // (read-only file or file system, rights) or the disk is full. The file is not
  // changed on failure.
  //
  // A dossier of an earlier schema version is brought to this one by `upgrades`, each
  // from one version to the next, in one transaction with its version number; one
  // that no step reaches, or of a later version, is refused.
  struct MiseANiveau {
    std::string from, to, sql;
  };
  static std::unique_ptr<Database> ouvrir(const std::string& path, const std::vector<MiseANiveau>& upgrades = {});
  // Opens or creates a plain database file (used to make a dossier, and in tests).
  static std::unique_ptr<Database> creer(const std::string& path);
  ~Database();

  const std::string& chemin() const { return path_; }
  void exec(std::string_view sql);
  // A cached prepared statement, reset and unbound.
  Statement& prepare(const std::string& sql);

  // Units of work nest; only the outermost commits or rolls back.
  //
  // Durability. The dossier is kept in write-ahead-log mode with synchronous NORMAL:
  // a commit is atomic, survives the death of the process at once, and survives a
  // power cut once the log has reached the disk. A unit begun `Sync::forced` (the
  // default) forces the log to the disk before its commit returns; a user action
  // begins `Sync::whenAsked` and is forced only if what it wrote includes something
  // the user will be told is kept (`forcer()`: an operation saved or deleted, a piece
  // written to the ledger). The log is written in order, so forcing it keeps every
  // unit committed before: a power cut can lose the last numbers drawn and work rows
  // kept since the last forced unit, never a saved operation.
  enum class Verrou { immediat, differe };
  enum class Sync { forced, whenAsked };
  // Thrown by `commit()` when the unit is committed but the disk refused to keep the
  // log: the work is done and must not be undone on screen, only reported.
  struct NonGarde : HostError {
    using HostError::HostError;
  };
  void begin(Verrou verrou = Verrou::immediat, Sync sync = Sync::forced);
  void commit();
  // The unit in progress must reach the disk before its commit returns.
  void forcer() { forced_ = true; }
  // Forced writes of the log so far, for the tests and the benchmarks.
  long long ecrituresForcees() const { return forced_writes_; }
  void rollback();
  int profondeur() const { return depth_; }
  // True while the unit holds the dossier's write lock (it wrote to the dossier).
  bool ecritureEnCours() const;
  // Rows changed by the last INSERT, UPDATE or DELETE.
  int changements() const;

  // Dictionary of a table (main or session-private); throws for an unknown table.
  const std::vector<Colonne>& colonnes(const std::string& table);
  std::vector<std::string> colonnesIndex(const std::string& table, const std::string& index);
  bool existe(const std::string& table);
  // Makes a private copy of a dossier table for this connection (work tables,
  // memory images): same columns, same keys, no rows.
  void creerCopiePrivee(const std::string& model, const std::string& name);
  void supprimerCopiePrivee(const std::string& name);
  // A memory image's copy outlives its automaton: it is emptied and kept for the next
  // one that needs a copy of the same table, because making or dropping a table
  // changes the schema, after which SQLite prepares every cached statement again.
  // libererCopiePrivee gives a copy back; reprendreCopiePrivee hands out an empty
  // spare copy of `model`, or nothing when there is none.
  void libererCopiePrivee(const std::string& name);
  std::optional<std::string> reprendreCopiePrivee(const std::string& model);

  sqlite3* brut() { return db_; }

 private:
  Database(sqlite3* db, std::string path) : db_(db), path_(std::move(path)) {}
  void forget(const std::string& table);
  void forgetStatements(const std::string& table);
  void emptyCopy(const std::string& name);
  // Runs a statement without result through the cache: a unit begins and ends at
  // every user action, and preparing those each time was a measurable part of one.
  void run(const std::string& sql);
  void syncLog();

  sqlite3* db_;
  std::string path_;
  int depth_ = 0;
  bool forced_ = true;
  long long forced_writes_ = 0;
  std::map<std::string, std::unique_ptr<sqlite3_stmt, void (*)(sqlite3_stmt*)>> statements_;
  std::map<std::string, Statement> wrappers_;
  std::map<std::string, std::vector<Colonne>> columns_;
  std::map<std::pair<std::string, std::string>, std::vector<std::string>> index_columns_;  // (table, index)
  std::map<std::string, std::string> private_copies_;  // name -> dossier table it copies
  std::multimap<std::string, std::string> spare_copies_;  // dossier table -> its empty spare copies
};

// Words for a system error number met on a dossier's file ("le disque est plein"),
// as the messages of opening and making a dossier say it.
std::string systemReason(int error);

// "NAME" quoted for SQL.
std::string quoteIdent(std::string_view name);
// 'text' quoted for SQL, quotes doubled.
std::string quoteText(std::string_view text);

// A unit of work begun on construction and rolled back when left without commit().
class Transaction {
 public:
  explicit Transaction(Database& db) : db_(db) { db_.begin(); }
  ~Transaction() {
    if (!done_) db_.rollback();
  }
  Transaction(const Transaction&) = delete;
  Transaction& operator=(const Transaction&) = delete;
  void commit() {
    db_.commit();
    done_ = true;
  }

 private:
  Database& db_;
  bool done_ = false;
};

}  // namespace host
