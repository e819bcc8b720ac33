// Where print jobs write: the printer of the process. A job starts a document, adds
// its blocks (a record, a line) as its handlers leave the variables, and ends it.
// Each document is kept in memory, as text lines for whoever reads it back and as
// blocks of named values for a layout; when the printer has a destination, the
// ended document is also laid out (model/layout.h) and written there as PDF.
#pragma once

#include <optional>
#include <string>
#include <utility>
#include <vector>

namespace model {

// Named values as a layout reads them: the job's variables ("VNOM"), then the fields
// of the record ("MIRVAE.NPIEC") and, for a line, of the line ("MIRVAL.LIBEC"),
// each as people see it (dates DD/MM/YYYY, amounts with a point).
using Values = std::vector<std::pair<std::string, std::string>>;

// The value of `name`, or "" when there is none.
const std::string& valueOf(const Values& values, const std::string& name);

struct Block {
  std::string kind;  // "fiche" (a record that has lines) or "ligne"
  std::string key;   // the record's IDENT, or the line's NUMERO
  Values values;
};

struct Impression {
  std::string module;                // the print job's module ("MIRVAE-IMPR_FICHE1")
  std::string requete;               // the request it printed
  std::vector<std::string> lignes;   // the text, one line a block
  Values heading;                    // the variables once the job has started
  std::vector<Block> blocks;
};

class Imprimante {
 public:
  // The printer of this thread.
  static Imprimante& courante();

  // A job starts a document, then appends its blocks to the last one.
  void commencer(std::string module, std::string requete);
  void entete(Values heading);
  void ecrire(std::string ligne, Block block);
  // The job ended. With a destination, the document is laid out with its module's
  // layout and written beside its place; once the user action has committed it is put
  // in place and the session's transcript names the file ("impression"). Throws
  // HostError when the module has no layout or the file cannot be written.
  void terminer();

  const std::vector<Impression>& impressions() const { return printed_; }
  // The last document printed; throws HostError when none was.
  const Impression& derniere() const;
  void vider() { printed_.clear(); }

  // Destinations: each document a new file in `folder` ("liste1-001.pdf", made when
  // missing), or every document into `file`, or nowhere (kept in memory only). With
  // a destination only the last document stays in memory.
  void versDossier(std::string folder);
  void versFichier(std::string file);
  void nullePart();
  // The file the last document was written to, "" when none.
  const std::string& dernierFichier() const { return last_file_; }

 private:
  std::vector<Impression> printed_;
  std::optional<std::string> folder_, file_;
  std::string last_file_;
};

// Sends the printer nowhere again when it goes out of scope (a command or a session
// script that gave it a destination).
class DestinationGuard {
 public:
  DestinationGuard() = default;
  ~DestinationGuard() { Imprimante::courante().nullePart(); }
  DestinationGuard(const DestinationGuard&) = delete;
  DestinationGuard& operator=(const DestinationGuard&) = delete;
};

}  // namespace model
