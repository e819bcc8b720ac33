// Piece numbers of client invoices: drawn from the journal's counter when the user
// leaves the header for the lines, with their period key and prefix, or typed.
#include <gtest/gtest.h>

#include "host/database.h"
#include "tests/entry/gestion1_fixture.h"

namespace {

using testing_support::Gestion1Test;

class NumerotationTest : public Gestion1Test {
 protected:
  // Fills the header and goes to the lines, which draws the number.
  bool versLesLignes(const std::string& date = "") {
    if (!creer()) return false;
    if (!date.empty() && !saisir("MIRVAE.DTOPE", date)) return false;
    return client() && model::nouvelleLigne(session());
  }
  std::string compteur(const std::string& key) {
    return sql("SELECT NUMERO FROM NUMPI WHERE NUMJL = 'VT' AND CLE = '" + key + "'");
  }
};

TEST_F(NumerotationTest, MonthlyCounterDrawsUnderTheYearMonthAndFillsTheLabel) {
  ASSERT_TRUE(creer());
  EXPECT_EQ(valeur("MIRVAE.NPIEC"), "[PIECE]");
  EXPECT_EQ(valeur("MIRVAE.INPIE"), "Facture client n° [PIECE]");
  ASSERT_TRUE(client());
  ASSERT_TRUE(model::nouvelleLigne(session()));
  EXPECT_EQ(compteur("202403"), "1");
  EXPECT_EQ(valeur("MIRVAE.NPIEC"), "VT1");
  EXPECT_EQ(valeur("MIRVAE.INPIE"), "Facture client n° VT1");
  // Drawn once: going back to the lines draws nothing more.
  ASSERT_TRUE(model::abandonnerLigne(session()));
  ASSERT_TRUE(saisir("MIRVAE.INPIE", "Facture client n° VT1"));
  ASSERT_TRUE(model::nouvelleLigne(session()));
  EXPECT_EQ(compteur("202403"), "1");
}

TEST_F(NumerotationTest, WithoutMonthlyRestartTheKeyIsTheExerciseOfTheDate) {
  sql("UPDATE JONAL SET RAZPI = 'N', PREFIXPI = '' WHERE NUMJL = 'VT'");
  sql("UPDATE PARAM SET PDTCL = '2025-12-31'");
  const struct {
    const char* date;
    const char* key;
  } cases[] = {{"31/12/2024", "N"}, {"01/01/2025", "N+1"}};
  for (const auto& c : cases) {
    SCOPED_TRACE(c.date);
    ASSERT_TRUE(versLesLignes(c.date));
    EXPECT_EQ(compteur(c.key), "1");
    EXPECT_EQ(valeur("MIRVAE.NPIEC"), "1");
    model::fermer(session());
  }
}

TEST_F(NumerotationTest, PrefixPatternIsPutBeforeTheDrawnNumber) {
  sql("UPDATE JONAL SET PREFIXPI = 'FC[AA][MM]-' WHERE NUMJL = 'VT'");
  ASSERT_TRUE(versLesLignes());
  EXPECT_EQ(valeur("MIRVAE.NPIEC"), "FC2403-1");
  EXPECT_EQ(valeur("MIRVAE.INPIE"), "Facture client n° FC2403-1");
}

TEST_F(NumerotationTest, TypingOverThePlaceholderAsksAndDecliningRestoresIt) {
  const std::string question =
      "Le journal VT est défini avec une numérotation automatique.@Confirmez-vous la saisie du N° pièce ?";
  ASSERT_TRUE(creer());
  ASSERT_TRUE(client());
  user_.ajouterOui(false);
  EXPECT_FALSE(saisir("MIRVAE.NPIEC", "A17"));
  EXPECT_EQ(session().transcript().textes("question").back(), question);
  EXPECT_EQ(valeur("MIRVAE.NPIEC"), "[PIECE]");

  user_.ajouterOui(true);
  EXPECT_TRUE(saisir("MIRVAE.NPIEC", "A17"));
  ASSERT_TRUE(model::nouvelleLigne(session()));
  EXPECT_EQ(valeur("MIRVAE.NPIEC"), "A17");
  EXPECT_EQ(valeur("MIRVAE.INPIE"), "Facture client n° A17");
  EXPECT_EQ(compteur("202403"), "");
}

TEST_F(NumerotationTest, ManualJournalRequiresTheNumberAndPutsItInTheLabel) {
  ASSERT_TRUE(creer());
  ASSERT_TRUE(saisir("MIRVAE.NUMJL", "VX"));
  EXPECT_FALSE(saisir("MIRVAE.NPIEC", ""));
  EXPECT_EQ(dernierMessage(), ecran().libelle("0413"));
  EXPECT_TRUE(saisir("MIRVAE.NPIEC", "EXP-12"));
  EXPECT_EQ(valeur("MIRVAE.INPIE"), "Facture client n° EXP-12");
}

TEST_F(NumerotationTest, CounterNotUpdatedWarnsAndKeepsTheNumber) {
  sql("CREATE TRIGGER numpi_bloque BEFORE INSERT ON NUMPI BEGIN SELECT RAISE(ABORT, 'compteur bloqué'); END");
  ASSERT_TRUE(versLesLignes());
  EXPECT_EQ(dernierMessage(), "N° de pièce impossible à modifier dans la table NUMPI");
  EXPECT_EQ(valeur("MIRVAE.NPIEC"), "VT1");
}

// Error 1 of the counter, the number drawn but not written, is a warning; error 2,
// the counter held by another process outside any action of this one, draws nothing.
TEST_F(NumerotationTest, CounterHeldByAnotherProcessRefusesTheNumberAndLeavesTheCounter) {
  ASSERT_TRUE(creer());
  ASSERT_TRUE(client());
  // Another process holds the dossier while the number is asked for outside any
  // action of this one.
  std::unique_ptr<host::Database> autre = host::Database::ouvrir(path_);
  autre->begin();
  entry::EntryScreen& screen = ecran();
  screen.oublierRefus();
  screen.executer("INCREMENTE_NUMERO_PIECE", nullptr);
  autre->rollback();
  EXPECT_TRUE(screen.refuse());
  EXPECT_EQ(screen.ecran()->focus(), "NPIEC");
  EXPECT_EQ(dernierMessage(), "La numérotation automatique de la pièce@est déjà réservée...Recommencez");
  EXPECT_EQ(valeur("MIRVAE.NPIEC"), "[PIECE]");
  EXPECT_EQ(compteur("202403"), "");
  EXPECT_EQ(base().profondeur(), 0);
  // Once the other process let go, the number is drawn from where the counter stood.
  ASSERT_TRUE(model::nouvelleLigne(session()));
  EXPECT_EQ(valeur("MIRVAE.NPIEC"), "VT1");
}

}  // namespace
