// Where print jobs write: the printer of the process, a list of printed
// documents made of text lines. Tests and the program read it; nothing is drawn.
#pragma once

#include <string>
#include <vector>

namespace model {

struct Impression {
  std::string module;                // the print job's module ("MIRVAE-IMPR_FICHE1")
  std::string requete;               // the request it printed
  std::vector<std::string> lignes;   // the text, one line an entry
};

class Imprimante {
 public:
  // The printer of this thread.
  static Imprimante& courante();

  // A job starts a document, then appends its lines to the last one.
  void commencer(std::string module, std::string requete);
  void ecrire(std::string ligne);

  const std::vector<Impression>& impressions() const { return printed_; }
  // The last document printed; throws HostError when none was.
  const Impression& derniere() const;
  void vider() { printed_.clear(); }

 private:
  std::vector<Impression> printed_;
};

}  // namespace model
