// A demo dossier with the ledger's services, operations written straight into MIRVAE,
// MIRVAL and MIRVAANA, and the ledger read back as a person would check it.
#pragma once

#include <string>
#include <vector>

#include "tests/support/fixture.h"

namespace testing_support {

struct LigneEssai {
  std::string numcp;
  std::string ht;
  std::string tva = "0";
  std::string cotva = "";
  // Analytic rows of the line: section, debit, credit.
  std::vector<std::vector<std::string>> ventilation = {};
  std::string sensDc = "";  // the line's own side, miscellaneous operations only
  std::string ttc = "";     // HT + TVA when empty
};

struct OperationEssai {
  std::string ident = "OP000001";
  std::string type = "FC";
  std::vector<LigneEssai> lignes;
  std::string ttc = "";  // the lines' total when empty
  std::string numcp = "411001";
  std::string numjl = "VT";
  std::string dtope = "2024-03-15";
  std::string monnaie = "EUR";
  std::string cours = "1";
  std::string npies = "";
  std::string typeDr = "";  // bank and cash: "D" payment, "R" receipt
};

class PostingTest : public DossierTest {
 protected:
  void SetUp() override;
  // Also checks that every piece of the ledger balances.
  void TearDown() override;

  void ecrire(const OperationEssai& op);
  // Runs the posting process of a kind ("MIRVAE-CREER_PIECE_" + type) on the
  // operation as one user action.
  void poster(const std::string& ident = "OP000001", const std::string& type = "FC");
  // Runs a module by name with a launch event, as one user action.
  void lancer(const char* module, host::Evt& evt);
  std::string npies(const std::string& ident = "OP000001");
  // The piece's movements in line order, "ACCOUNT D|C AMOUNT" ("706000 C 100.00").
  std::vector<std::string> mouvements(const std::string& npies);
  // The DEBUT_LIGNE calls of the import, with the account each read.
  std::vector<std::string> lignesEnvoyees() const;
  std::vector<std::string> messages();
  long long compte(const std::string& query);

  // The import component's procedures as called, "DEBUT_LIGNE 706000" for a movement.
  std::vector<std::string> appels_;
};

}  // namespace testing_support
