// An entry screen driven as a user would, the client invoice screen unless a test
// sets `kind_`, on a fresh demo dossier (today 15/03/2024, exercise 2024, sales
// journal VT numbered automatically with the prefix "VT" and a monthly restart).
#pragma once

#include <string>
#include <vector>

#include "entry/gestion1.h"
#include "host/table.h"
#include "model/mains.h"
#include "model/traitmnt.h"
#include "tests/support/fixture.h"

namespace testing_support {

class Gestion1Test : public DossierTest {
 protected:
  // Opens a new creation, as from the menu.
  bool creer() { return model::ouvrir(session(), "MIRVAE-GESTION" + std::to_string(kind_)); }

  // Opens operation `ident` with a mode string, as the browser does.
  bool ouvrirFiche(const std::string& ident, const std::string& mode) {
    struct Lanceur : model::Traitmnt {
      explicit Lanceur(host::Evt* e) : Traitmnt(e) {}
    } lanceur(nullptr);
    return session().action([&] {
      lanceur.lancerModule("", "MIRVAE", ("GESTION" + std::to_string(kind_)).c_str(),
                           new host::EvtParamVal(2, ident, mode));
      session().executerFile();
    });
  }

  entry::EntryScreen& ecran() { return dynamic_cast<entry::EntryScreen&>(model::ecranDevant(session())); }
  bool ouvert() { return session().ecran("MIRVAE-GESTION" + std::to_string(kind_)) != nullptr; }

  bool saisir(const std::string& object, const std::string& text) {
    return model::saisir(session(), object, text);
  }
  std::string valeur(const std::string& object) { return model::valeur(session(), object); }
  bool appuyer(const std::string& action) { return model::appuyer(session(), action); }

  // A header that passes every check: the client, today's date, the first sales journal.
  bool client(const std::string& label = "Brasserie Lissandre") { return saisir("VLIBCP1", label); }

  int kind_ = 1;

  // Types a line: account, then (when given) VAT code, then amount; validates it when asked.
  bool ligne(const std::string& account, const std::string& amount, const std::string& vatCode = "-",
             bool validate = true) {
    if (!model::nouvelleLigne(session())) return false;
    if (!saisir("LST_MIRVAL.NUMCP", account)) return false;
    if (vatCode != "-" && !saisir("LST_MIRVAL.COTVA", vatCode)) return false;
    if (!saisir("LST_V_HT", amount)) return false;
    return !validate || model::validerLigne(session());
  }

  // A client invoice of two lines: 100 at 20 % and 50 without VAT.
  bool facture() { return creer() && client() && ligne("708500", "100") && ligne("758000", "50"); }

  // Presses the validation button and answers the dialog of a creation with `choice`.
  bool enregistrer(const std::string& choice = "1") {
    user_.ajouterDialogue(choice);
    return appuyer("B_VALID_DOC");
  }

  std::vector<std::string> messages() { return session().transcript().textes("message"); }
  std::string dernierMessage() {
    auto all = messages();
    return all.empty() ? std::string() : all.back();
  }
  long long nombre(const std::string& query) { return std::stoll(sql(query)); }

  // A saved client invoice written straight into the tables, as an earlier session left it.
  void operationEnregistree(const std::string& ident, const std::string& type = "FC",
                            const std::string& dtope = "2024-03-10", const std::string& npies = "") {
    host::Statement& s = base().prepare(
        "INSERT INTO MIRVAE (IDENT, TYPE, DTOPE, NUMCP, NUMJL, NPIEC, INPIE, NPIES, MONNAIE_IDENT, COURS, DTECH, "
        "SAISIE_MTT, HT, TVA, TTC, DATEC, HEUREC, DATEM, HEUREM, USERM) VALUES (?, ?, ?, '411001', 'VT', 'VT7', "
        "'Facture client n° VT7', ?, 'EUR', 1, ?, '1', '150', '20', '170', '2024-03-10', '09:15:00', "
        "'2024-03-12', '16:40:05', 'compta')");
    s.bind(1, ident).bind(2, type).bind(3, dtope).bind(4, npies).bind(5, dtope);
    s.step();
    s.reset();
    const char* lines[][5] = {{"|000001", "L1", "708500", "V20", "100"}, {"|000002", "L2", "758000", "", "50"}};
    for (const auto& l : lines) {
      host::Statement& m = base().prepare(
          "INSERT INTO MIRVAL (IDENT, NUMERO, NUMCP, LIBEC, COTVA, TXTVA, HT, TVA, TTC) VALUES (?, ?, ?, 'Ligne', ?, "
          "?, ?, ?, ?)");
      bool vat = std::string(l[3]) == "V20";
      std::string ht = l[4];
      m.bind(1, ident + l[1]).bind(2, ident + l[0]).bind(3, std::string(l[2])).bind(4, std::string(l[3]));
      m.bind(5, vat ? 20.0 : 0.0).bind(6, ht).bind(7, std::string(vat ? "20" : "0"));
      m.bind(8, std::string(vat ? "120" : "50"));
      m.step();
      m.reset();
    }
  }
};

}  // namespace testing_support
