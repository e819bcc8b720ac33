// Print jobs: Edition_etat2 : Edition_etat : Impetat : Traitmnt.
//
// A job is given its request as SQL text, applied to its main table before it
// starts (applyRequest; the interface's "IMPRESSION" does it): the main table's
// requete() then gives that text back. The run, one pass:
//   1. "DEBUT" (a handler that leaves stops the job);
//   2. for each row of the request, the main table's buffer on it: "DEBUT_FICHE",
//      then its body rows: when the job binds a table with a NUMERO column (the
//      lines, "MIRVAL"), each of that table's rows whose NUMERO begins with the
//      record's IDENT + "|", in key order, with that binding's buffer on it;
//      otherwise the record itself. Per body row "LST_DEBUT_FICHE",
//      "LST_DEBUT1_IMPRIME" and "LST_CORPS_IMPRIME" run;
//   3. the end.
// The job writes to the printer (model/impression.h) one document, under its
// module's name and request: the variables once "DEBUT" ran (a list's heading), per
// record with lines a block "fiche", and per body row a block "ligne", each with
// the row's key (IDENT, or the line's NUMERO), the job's variables as the handlers
// left them and the fields of the record (and of the line), which is what a layout
// prints. The text line of a block holds its kind, key and variables ("NAME=value",
// separated by " | "). Once the records are printed the printer ends the document.
//
// The request is run as it is given, once checked to be a single statement that
// only reads; "TABLE" in it (the form requests say "Select * From TABLE Where
// ...") stands for the main table.
#pragma once

#include <string>

#include "model/impression.h"
#include "model/traitmnt.h"

namespace model {

class Impetat : public Traitmnt {
 public:
  explicit Impetat(Evt* e);

  // Gives the job its request. Throws HostError when the text is not one reading
  // statement.
  void applyRequest(const std::string& sql);
  const std::string& request() const { return request_; }

  // "DEBUT_FICHE": a record starts; the base writes nothing (the record's line is
  // written once the handlers have filled the variables).
  virtual void debut_fiche(Evt* e);

  void demarrer() override;

 private:
  void printRecord();
  Values variableValues() const;
  // Writes a block, with the fields of the main table and of `lines` when given.
  void print(const std::string& kind, const std::string& key, Table* lines);

  std::string request_;
};

class Edition_etat : public Impetat {
 public:
  explicit Edition_etat(Evt* e) : Impetat(e) {}
};

class Edition_etat2 : public Edition_etat {
 public:
  explicit Edition_etat2(Evt* e) : Edition_etat(e) {}

  // "DEBUT": the base of print jobs; it does nothing.
  void debut(Evt* e) override;
};

}  // namespace model
