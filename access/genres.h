// What differs between the access screens of the six operation kinds.
#pragma once

#include <string>

namespace browser {

struct GenreAcces {
  int chiffre;                 // 1 to 6: ends the names of the entry screen and prints
  const char* type;            // MIRVAE.TYPE kept in the list
  const char* nature;          // nature letter of the header accounts ("" for none)
  const char* compteInexistant;  // message when the typed account is unknown
  const char* titreInexistant;   // start of a row's title when its account is gone

  std::string module() const { return "MIRVAE-ACCES" + std::to_string(chiffre); }
  std::string gestion() const { return "GESTION" + std::to_string(chiffre); }
  std::string fiche() const { return "fiche" + std::to_string(chiffre); }
  std::string liste() const { return "liste" + std::to_string(chiffre); }
  std::string ecran() const { return "+ACCES" + std::to_string(chiffre); }
};

// Client invoices and supplier invoices: one account of one nature.
extern const GenreAcces kFacturesClients;
extern const GenreAcces kFacturesFournisseurs;

}  // namespace browser
