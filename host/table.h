// Table and Champ: a cursor over one table of the dossier, and its fields.
//
// A Table binding has its own record buffer, its own request and its own position;
// two bindings of one table (aliases COMPT1 and COMPT2 on COMPT) never disturb each
// other. It guarantees:
//   - The record buffer holds one value per column, of the column's kind. raz()
//     blanks it; lit() and suivant() fill it from the database; ecrit() writes it
//     back: an insert when the buffer was blanked, an update of the row it was read
//     from otherwise. supprime() deletes that row.
//   - A row of the dossier is written back or deleted only if it is still as the
//     binding last read or wrote it: another user may have changed or deleted it
//     since (even in an earlier action of this one). Otherwise ecrit() and supprime()
//     throw HostError saying so, and nothing is written.
//   - The request (initRequete, ajouteFiltre, choisitIndex) is only text until
//     activeRequete(); suivant(3) then reads its first row in index order and
//     suivant(1) the row after the current one. The position is kept as the index
//     key of the current row, so writes made meanwhile never lose it.
//   - A filter value is taken when the filter is added, and always bound, never
//     pasted into SQL. requete() gives the same request as text that SQLite runs,
//     each condition written FIELD op 'value'.
//   - A table whose name starts with "MEM:" is a memory image owned by its
//     automaton: private, empty at first, emptied when the automaton goes (and
//     kept for the next one that needs the same image). All the bindings of one
//     image in one automaton (MEM_MIRVAANA and MEM_MIRVAANA2 on
//     "MEM:MIRVAANA_M01") are cursors on the same rows. Work tables
//     (_M01, _M02, MEM02, MEM04) are private to the session and shared by its
//     automata. Every other table is the dossier's.
// The binding opens lazily, at its first use, so a main table may be named after
// its fields are declared.
#pragma once

#include <optional>
#include <string>
#include <vector>

#include "host/database.h"
#include "host/value.h"

namespace host {

class Automate;
class Champ;
class Snapshot;

class Table {
 public:
  // Table(owner, base text, name, alias, nullptr, nullptr, kind 69, 1).
  Table(Automate* owner, const char* base, const char* name, const char* alias, void* a = nullptr,
        void* b = nullptr, int kind = 69, int flag = 1);
  Table(const Table&) = delete;
  Table& operator=(const Table&) = delete;
  ~Table();

  // Name of the table in the dossier ("COMPT") and name of the binding ("COMPT1").
  const std::string& nom() const { return name_; }
  const std::string& alias() const { return alias_.empty() ? name_ : alias_; }
  void renommer(const std::string& name);  // the main table, named by nomTable

  // ---- request
  void initRequete();
  // op: '=' equal, '#' different, '+' at least, '-' at most, '/' begins with,
  // '?' contains the one-letter code (nature letters). Joined with 'A' (and).
  void ajouteFiltre(Champ& field, char op, const Valeur& value, char join = 'A');
  void ajouteFiltre(Champ& field, char op, const Donnee& value, char join = 'A');
  void ajouteFiltre(Champ& field, char op, std::string_view value, char join = 'A');
  void ajouteFiltre(Champ& field, char op, const char* value, char join = 'A');
  // Orders by the dossier index <TABLE>_<name>, or by the field of that name.
  void choisitIndex(const char* name, char unused = 'A');
  void activeRequete();
  std::string requete();
  bool requeteActive() const { return active_; }
  // A request given whole as SQL text (a print job's request): requete() gives it
  // back until initRequete(). The cursor does not run it; the print model does.
  void setRequestText(std::string sql) { request_text_ = std::move(sql); }
  const std::optional<std::string>& requestText() const { return request_text_; }

  // ---- reading: 0 when a row was read, non-zero when there is none (buffer kept)
  int lit(int mode, Champ& field, char op, const Valeur& value);
  int lit(int mode, Champ& field, char op, const Donnee& value);
  int lit(int mode, Champ& field, char op, std::string_view value);
  int lit(int mode, Champ& field, char op, const char* value);
  // mode 3: first row of the request; mode 1: the row after the current one.
  int suivant(int mode, char unused = 'A');
  // Where the cursor stands in its request: the current row as read. Put back, the
  // next suivant(1) goes on after that row, even if the row is gone meanwhile.
  struct Position {
    std::vector<Valeur> buffer;
    std::optional<long long> rowid;
    long long asRead = 0;
  };
  Position position() const { return {buffer_, rowid_, as_read_}; }
  void replacer(const Position& p);

  // ---- writing
  void raz(char mode = 0);  // blank record; the next ecrit() inserts
  void ecrit();
  void supprime();          // deletes the current row
  void vide();              // deletes every row the request selects (all without filters)
  long long nombre();       // rows the request selects

  // ---- record buffer
  bool estNouveau() const { return !rowid_; }
  Valeur valeur(const std::string& column);
  void affecter(const std::string& column, const Valeur& v);
  const std::vector<Colonne>& colonnes();
  // Copies the columns of the same name from another binding's buffer.
  void copier(Table& from);

  Automate* owner() const { return owner_; }

  // Keeps the buffer, the position and the request for a failed action to put back.
  void keepState(Snapshot& snapshot);

 private:
  friend class Champ;
  struct Filtre {
    std::string column;
    char op;
    Valeur value;
  };

  void open();
  std::size_t index(const std::string& column);
  Valeur& slot(std::size_t i);
  // The WHERE clause of the filters; `seekColumn`: the column a position starts with.
  std::string where(bool forText, const std::string& seekColumn = {}) const;
  void bindFilters(Statement& s, int& next) const;
  std::string orderBy() const;
  void load(Statement& s);
  std::string sqlName() const;
  std::string columnHash() const;  // empreinte_ligne over every column, as SQL
  [[noreturn]] void changedMeanwhile();

  Automate* owner_;
  std::string name_, alias_, physical_;
  Database* db_ = nullptr;
  bool private_copy_ = false;
  bool checked_ = false;  // a dossier table: rows are written back only if unchanged
  const std::vector<Colonne>* columns_ = nullptr;
  std::vector<Valeur> buffer_;
  std::optional<long long> rowid_;
  long long as_read_ = 0;  // empreinteLigne of the row as last read or written (dossier rows)
  std::vector<Filtre> filters_;
  std::vector<std::string> order_;
  bool active_ = false;
  std::optional<std::string> request_text_;
};

// A field of a binding, used like a value: reading gives the buffer's value,
// writing sets it (converted to the column's kind).
class Champ : public Donnee {
 public:
  Champ(Automate* owner, const char* field, Table* table, int flag = 1);
  Champ(const char* field, Table* table, int flag = 1);
  using Donnee::operator=;
  Champ& operator=(const Champ& other) {
    Donnee::operator=(other);
    return *this;
  }

  Genre genre() const override;
  Table& table() const { return *table_; }

 protected:
  Valeur lire() const override;
  void ecrire(Valeur v) override;

 private:
  Table* table_;
};

}  // namespace host
