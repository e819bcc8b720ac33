// Checks of a client invoice before it is saved, and the account check of the header
// and of the lines.
#include <functional>

#include <gtest/gtest.h>

#include "tests/entry/gestion1_fixture.h"

namespace {

using testing_support::Gestion1Test;

class ControlesTest : public Gestion1Test {};

TEST_F(ControlesTest, HeaderChecksRunInOrderAndOnlyTheFirstFailureIsShown) {
  // Each fault is made together with every fault checked after it: only its own
  // message may show, with the focus on its control.
  struct Faute {
    const char* message;
    const char* focus;
    std::function<void()> faire;
  };
  const std::vector<Faute> fautes = {
      {"La saisie d'une date d'opération est obligatoire !", "DTOPE",
       [&] { ASSERT_TRUE(saisir("MIRVAE.DTOPE", "")); }},
      {"Le journal <ZZ> n'existe pas ou n'est pas de la nature attendue !", "NUMJL",
       [&] { ASSERT_TRUE(saisir("MIRVAE.NUMJL", "ZZ")); }},
      {"Le journal <AC> n'existe pas ou n'est pas de la nature attendue !", "NUMJL",
       [&] { ASSERT_TRUE(saisir("MIRVAE.NUMJL", "AC")); }},
      {"Le journal <VT> est clos pour cette date !", "DTOPE",
       [&] { sql("UPDATE JONAL SET CLOAM = '202403' WHERE NUMJL = 'VT'"); }},
      {"La saisie d'un numéro de pièce est obligatoire !", "NPIEC",
       [&] {
         user_.ajouterOui(true);
         ASSERT_TRUE(saisir("MIRVAE.NPIEC", ""));
       }},
      {"La saisie d'un client est obligatoire !", "VLIBCP1", [&] { ASSERT_TRUE(saisir("VLIBCP1", "")); }},
      {"La saisie d'un libellé de pièce est obligatoire !", "INPIE",
       [&] { ASSERT_TRUE(saisir("MIRVAE.INPIE", "")); }},
      {"Aucune ligne n'a été saisie.@La validation est impossible !", "", [] {}},
  };
  for (std::size_t i = 0; i < fautes.size(); ++i) {
    SCOPED_TRACE(fautes[i].message);
    sql("UPDATE JONAL SET CLOAM = '' WHERE NUMJL = 'VT'");
    ASSERT_TRUE(creer());
    ASSERT_TRUE(client());
    for (std::size_t j = fautes.size(); j-- > i;) fautes[j].faire();
    enregistrer("1");
    EXPECT_EQ(dernierMessage(), fautes[i].message);
    EXPECT_EQ(ecran().ecran()->focus(), fautes[i].focus);
    EXPECT_EQ(nombre("SELECT count(*) FROM MIRVAE"), 0);
    model::fermer(session());
  }
}

TEST_F(ControlesTest, NoLineBeforeTheHeaderPassesAndNoPieceWhoseLinesTotalZero) {
  ASSERT_TRUE(creer());
  EXPECT_FALSE(model::nouvelleLigne(session()));
  EXPECT_EQ(dernierMessage(), "La saisie d'un client est obligatoire !");
  ASSERT_TRUE(client());
  ASSERT_TRUE(ligne("708500", "100"));
  ASSERT_TRUE(ligne("708500", "-100"));
  enregistrer("1");
  EXPECT_EQ(dernierMessage(), "La saisie d'une pièce dont le total est nul n'est pas autorisée !");
  EXPECT_EQ(nombre("SELECT count(*) FROM MIRVAE"), 0);
}

TEST_F(ControlesTest, OperationDateMustLieBetweenExerciseStartAndClosingDate) {
  ASSERT_TRUE(creer());
  EXPECT_FALSE(saisir("MIRVAE.DTOPE", "31/12/2023"));
  EXPECT_EQ(dernierMessage(), ecran().libelle("0134"));
  EXPECT_FALSE(saisir("MIRVAE.DTOPE", "01/01/2025"));
  EXPECT_EQ(dernierMessage(), ecran().libelle("0135"));
  EXPECT_EQ(valeur("MIRVAE.DTOPE"), "15/03/2024");
  // The closing date itself is open, and the due date follows the operation date.
  EXPECT_TRUE(saisir("MIRVAE.DTOPE", "31/12/2024"));
  EXPECT_EQ(valeur("MIRVAE.DTECH"), "31/12/2024");
}

TEST_F(ControlesTest, AccountCheckNamesWhatIsWrong) {
  // An account left out of the lists is refused even with the right nature.
  sql("UPDATE COMPT SET CCTRA = 'O' WHERE NUMCP = '758000'");
  const struct {
    const char* object;
    const char* value;
    const char* message;  // nullptr: accepted
  } cases[] = {
      {"VLIBCP1", "Inconnu SA", "Le compte Client est inexistant !"},
      {"VLIBCP1", "Scierie Maurel Frères", "Le compte n'est pas de nature <Client> !"},
      {"VLIBCP1", "Ancien client Dufaure", "Le compte n'est pas de nature <Client> !"},
      {"VLIBCP1", "Cabinet Vaillergues", nullptr},
      {"LST_MIRVAL.NUMCP", "999999", "Le compte est inexistant !"},
      {"LST_MIRVAL.NUMCP", "601000", "Le compte n'est pas de nature <Produit> !"},
      {"LST_MIRVAL.NUMCP", "758000", "Le compte n'est pas de nature <Produit> !"},
      {"LST_MIRVAL.NUMCP", "", nullptr},
      {"LST_MIRVAL.NUMCP", "707000", nullptr},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(std::string(c.object) + " = " + c.value);
    ASSERT_TRUE(creer());
    if (std::string(c.object) != "VLIBCP1") {
      ASSERT_TRUE(client());
      ASSERT_TRUE(model::nouvelleLigne(session()));
    }
    std::size_t before = messages().size();
    bool accepted = saisir(c.object, c.value);
    if (c.message) {
      EXPECT_FALSE(accepted);
      EXPECT_EQ(dernierMessage(), c.message);
      EXPECT_EQ(ecran().ecran()->focus(), c.object);
    } else {
      EXPECT_TRUE(accepted);
      EXPECT_EQ(messages().size(), before);
    }
    model::fermer(session());
  }
  // A client typed by its title sets the header's account, and an empty title clears it.
  ASSERT_TRUE(creer());
  ASSERT_TRUE(client("Cabinet Vaillergues"));
  EXPECT_EQ(valeur("MIRVAE.NUMCP"), "411003");
  ASSERT_TRUE(saisir("VLIBCP1", ""));
  EXPECT_EQ(valeur("MIRVAE.NUMCP"), "");
}

}  // namespace
