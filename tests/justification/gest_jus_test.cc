// The justification of one settlement line, opened as the bank entry screen opens it,
// on one due date of client 411001 written into the demo dossier's ledger.
#include <gtest/gtest.h>

#include <functional>
#include <string>
#include <vector>

#include "model/mains.h"
#include "tests/services/appelant.h"

namespace {

using namespace host;
using model::appuyer;
using model::saisir;
using testing_support::ServicesTest;

// The invoice that carries the due date: its currency and rate, its amounts in
// keeping and piece currency, its conversion difference, and the side of its movement.
struct Facture {
  std::string monnaie = "EUR", cours = "1";
  std::string mtech = "1200", mtechs = "1200", ecart = "0";
  bool credit = false;  // a credit note: the client's movement is a credit
};

// The settlement: a receipt of `montant` in `monnaie` at `cours`.
struct Reglement {
  std::string montant = "1200", monnaie = "EUR", cours = "1";
};

class GestJusTest : public ServicesTest {
 protected:
  void echeance(const Facture& f) {
    sql("INSERT INTO PIECE (NPIES, NPIEC, NUMJL, DTOPE, DTPIE, MONNAIE_IDENT, COURS) VALUES ('00000000001', 'VT1', "
        "'VT', '2024-03-01', '2024-03-01', '" + f.monnaie + "', " + f.cours + ")");
    sql(std::string("INSERT INTO MOUVE (UNIQ, NPIES, NLIGS, NUMCP, NUMJL, DTOPE, MTDEB, MTCRE, INDX2) VALUES (1, "
                    "'00000000001', '000000000010001', '411001', 'VT', '2024-03-01', '") +
        (f.credit ? "0" : f.mtech) + "', '" + (f.credit ? f.mtech : "0") + "', '411001|2024-03-01')");
    sql("INSERT INTO ECHEA (NUSYS, UNIQ, NPIES, INDX1, DTECH, MTECH, MTECHS, ECART, MTRES, MTRESS) VALUES (1, 1, "
        "'00000000001', '1', '2024-04-01', '" + f.mtech + "', '" + f.mtechs + "', '" + f.ecart + "', '" + f.mtech +
        "', '" + f.mtechs + "')");
  }

  // Opens the screen for line L1, plays `steps` on it; false when it could not open.
  bool ouvrir(const Reglement& r, const std::function<void(Session&)>& steps) {
    Chaine ident("L1"), typjl("T"), typcpt("T"), numcp("411001"), monnaie(r.monnaie);
    Monnaie debit, credit;
    credit = *Decimal::parse(r.montant);
    Date debex, dtope;
    debex = "01/01/2024";
    dtope = "15/03/2024";
    Double cours(std::stod(r.cours));
    EvtParamRef evt(10, &ident, &typjl, &typcpt, &numcp, &debit, &credit, &debex, &dtope, &monnaie, &cours);
    user_.ajouterPilotage([&](Session& s, Automate&) { steps(s); });
    return lancer("", "MIRVAE", "GEST_JUS", evt);
  }

  std::string row(Session& s, const char* column) { return model::lignes(s).at(0).at(column); }
  // The line's justification rows as the entry screen gets them back.
  std::string kept() {
    return sql("SELECT group_concat(NUSYS || ' ' || MTREG || ' ' || MTREGS, ', ') FROM MIRVAJUS_M01 "
               "WHERE IDENTR = 'L1'");
  }
};

// The amounts of a settled row in keeping currency, its rounding and exchange
// differences, by the currencies that meet and the due date's sign.
TEST_F(GestJusTest, TheSettledAmountIsValuedByTheCurrenciesThatMeet) {
  struct Cas {
    const char* cas;
    Facture facture;
    Reglement reglement;
    const char* typed;
    bool accepted;
    const char* column, *mtregs, *mtreg, *mteeur, *mtechg;
  };
  const Cas cases[] = {
      {"tout en euros", {}, {}, "1200", true, "1", "1200.00", "1200.00", "0.00", "0.00"},
      {"dollar réglé en dollars", {"USD", "1.10", "909.09", "1000", "0"}, {"1000", "USD", "1.05"}, "1000", true,
       "31", "1000.00", "952.38", "0.00", "-43.29"},
      {"avoir", {.mtech = "330", .mtechs = "330", .credit = true}, {}, "330", true, "1", "-330.00", "-330.00",
       "0.00", "0.00"},
      {"écart de conversion compris", {.mtech = "100", .mtechs = "100", .ecart = "0.01"}, {}, "100.01", true, "1",
       "100.01", "100.01", "0.00", "0.00"},
      {"un centime de trop", {.mtech = "100", .mtechs = "100", .ecart = "0.01"}, {}, "100.02", false, "1", "0.00",
       "0.00", "0.00", "0.00"},
  };
  for (const Cas& c : cases) {
    SCOPED_TRACE(c.cas);
    sql("DELETE FROM PIECE");
    sql("DELETE FROM MOUVE");
    sql("DELETE FROM ECHEA");
    echeance(c.facture);
    bool opened = ouvrir(c.reglement, [&](Session& s) {
      EXPECT_EQ(model::valeur(s, "V_FLAG_COL"), c.column);
      EXPECT_EQ(saisir(s, "LST_MIRVAJUS_M02.MTREGS", c.typed), c.accepted);
      EXPECT_EQ(row(s, "MTREGS") + " " + row(s, "MTREG") + " " + row(s, "MTEEUR") + " " + row(s, "MTECHG"),
                std::string(c.mtregs) + " " + c.mtreg + " " + c.mteeur + " " + c.mtechg);
      user_.ajouterOui(true);
      appuyer(s, "ABAND");
    });
    ASSERT_TRUE(opened) << session().transcript().rendu();
  }
}

// Validation keeps a whole justification or none: a part is refused, nothing is
// accepted, and a first validation without change puts the remainder on the row.
TEST_F(GestJusTest, ValidationKeepsAWholeJustificationOrNone) {
  echeance({});
  struct Cas {
    const char* cas;
    std::vector<const char*> typed;  // amounts typed on the row before validating
    const char* message;             // after the last validation, "" for none
    const char* kept;
  };
  const Cas cases[] = {
      {"une partie", {"500"}, "Le règlement n'est justifié qu'en partie.@", ""},
      {"rien", {"0"}, "", ""},
      {"le tout", {"1200"}, "", "1 1200 1200"},
  };
  for (const Cas& c : cases) {
    SCOPED_TRACE(c.cas);
    sql("DELETE FROM MIRVAJUS_M01");
    session().transcript().vider();
    ASSERT_TRUE(ouvrir({}, [&](Session& s) {
      for (const char* amount : c.typed) ASSERT_TRUE(saisir(s, "LST_MIRVAJUS_M02.MTREGS", amount));
      appuyer(s, "VALID");
      if (std::string(c.message).empty()) return;
      EXPECT_NE(session().transcript().textes("message").back().find(c.message), std::string::npos);
      user_.ajouterOui(true);
      appuyer(s, "ABAND");
    }));
    EXPECT_EQ(kept(), c.kept);
  }

  // Nothing typed: the first validation fills the row and stays, the second keeps it.
  sql("DELETE FROM MIRVAJUS_M01");
  ASSERT_TRUE(ouvrir({}, [&](Session& s) {
    appuyer(s, "VALID");
    ASSERT_EQ(model::ecranDevant(s).code(), "MIRVAE-GEST_JUS");
    EXPECT_EQ(row(s, "MTREGS"), "1200.00");
    EXPECT_EQ(model::valeur(s, "V_RESTE_A_JUSTIF"), "0.00");
    appuyer(s, "VALID");
  }));
  EXPECT_EQ(kept(), "1 1200 1200");

  // Opened again, the justification is shown; changing it first asks to cancel it.
  ASSERT_TRUE(ouvrir({}, [&](Session& s) {
    EXPECT_EQ(row(s, "MTREGS"), "1200.00");
    user_.ajouterOui(true);
    ASSERT_TRUE(saisir(s, "LST_MIRVAJUS_M02.MTREGS", "0"));
    EXPECT_EQ(model::valeur(s, "V_RESTE_A_JUSTIF"), "1200.00");
    user_.ajouterOui(true);
    appuyer(s, "ABAND");
  }));
  EXPECT_EQ(kept(), "1 1200 1200");
}

// A due date that another line of the operation justifies already is not offered:
// with nothing else open the screen says so and closes.
TEST_F(GestJusTest, ADueDateJustifiedByAnotherLineIsNotOffered) {
  echeance({});
  sql("INSERT INTO MIRVAJUS_M01 (IDENTR, NUSYS, MTREG, MTREGS) VALUES ('L2', 1, '1200', '1200')");
  bool shown = false;
  ouvrir({}, [&](Session&) { shown = true; });
  EXPECT_FALSE(shown);
  ASSERT_FALSE(vus("message").empty());
  EXPECT_EQ(vus("message").back(), "Aucune échéance à justifier pour ce compte.");
}

}  // namespace
