// The access screen's cycle, driven through the user's hands on a small screen of
// the tests' own over the real MIRVAE table.
#include "model/acces.h"

#include <gtest/gtest.h>

#include "host/error.h"
#include "host/registry.h"
#include "host/table.h"
#include "model/mains.h"
#include "model/traitecr.h"
#include "tests/support/fixture.h"

namespace {

using namespace host;

std::vector<std::string> journal;
std::string quitAt;  // the start step at which the screen leaves

struct ListeTest : model::Acces2 {
  Chaine VFILTRE{"VFILTRE", "", "", 0, this};
  Chaine VLIBCP2{"VLIBCP2", "", "", 0, this};
  Champ TYPE{this, "TYPE", table(false)};
  Champ NUMCP{this, "NUMCP", table(false)};
  Champ IDENT{this, "IDENT", table(false)};

  explicit ListeTest(Evt* e) : Acces2(e) {
    nomTable("MIRVAE", nullptr);
    addBranch("INIT", &ListeTest::pas);
    addBranch("AVANT_DEBUT", &ListeTest::pas);
    addBranch("DEBUT", &ListeTest::pas);
    addBranch("ACTIVE_REQUETE", &ListeTest::active_requete);
    addBranch("LST_SELECTION", &ListeTest::lst_selection);
    addBranch("LST_LISTE_VIDE", &ListeTest::lst_liste_vide);
    addBranch("LST_LISTE_PLEINE", &ListeTest::lst_liste_pleine);
    addBranch("VFILTRE", &ListeTest::vfiltre);
    addBranch("GERER", &ListeTest::gerer);
    addBranch("PLUS_TARD", &ListeTest::pas);
    addBranch("DEBUT_ACTIVATION", &ListeTest::debut_activation);
  }
  void pas(Evt* e) {
    journal.push_back(e->nom());
    if (e->nom() == quitAt) sortir(e, 0);
  }
  void active_requete(Evt* e) override {
    Scritere::active_requete(e);
    journal.push_back(e->nom());
    table(false)->initRequete();
    table(false)->ajouteFiltre(TYPE, '=', "FC");
    table(false)->choisitIndex("INDX1");
    table(false)->activeRequete();
  }
  void lst_selection(Evt* e) {
    journal.push_back(e->nom() + " " + IDENT.chaine());
    if (!VFILTRE.estVide() && NUMCP == VFILTRE.chaine()) {
      rejeter(e);
      return;
    }
    VLIBCP2 = "Compte " + NUMCP.chaine();
  }
  void lst_liste_vide(Evt* e) {
    journal.push_back(e->nom());
    ecran()->interdit("GERER", "");
  }
  void lst_liste_pleine(Evt* e) {
    journal.push_back(e->nom());
    ecran()->autorise("GERER", "");
  }
  void vfiltre(Evt*) { appelerProcedure("", "", "", "ACTIVE_REQUETE", nullptr, 0); }
  void gerer(Evt* e) {
    lancerProcedure("", "", "", "PLUS_TARD", nullptr, 0);
    journal.push_back(e->nom() + " " + IDENT.chaine());
  }
  void debut_activation(Evt* e) override {
    journal.push_back(e->nom());
    Acces::debut_activation(e);
  }
};

struct EcranLibre : model::Traitecr {
  Chaine VNOM{"VNOM", "", "", 0, this};
  explicit EcranLibre(Evt* e) : Traitecr(e) {
    addBranch("CTRL_DEBUT_MODIF", &EcranLibre::ctrl_debut_modif);
    addBranch("DEBUT", &EcranLibre::debut);
  }
  void debut(Evt* e) override { journal.push_back(e->nom()); }
  void ctrl_debut_modif(Evt* e) override {
    if (e->parametre(0).chaine() == "VNOM" && journal.size() > 5) rejeter(e);
    journal.push_back("CTRL_DEBUT_MODIF " + e->parametre(0).chaine());
  }
};

class AccesTest : public testing_support::DossierTest {
 protected:
  void SetUp() override {
    DossierTest::SetUp();
    testing_support::moduleDeTest<ListeTest>("TEST-MODELE_ACCES");
    testing_support::moduleDeTest<EcranLibre>("TEST-MODELE_ECRAN");
    journal.clear();
    quitAt.clear();
    base().exec(
        "INSERT INTO MIRVAE (IDENT, TYPE, NUMCP, DTOPE) VALUES "
        "('A1', 'FC', '411001', '2024-03-01'), ('A2', 'FC', '411002', '2024-03-02'), "
        "('A3', 'FC', '411001', '2024-03-03'), ('B1', 'FF', '401001', '2024-03-01')");
  }
  std::vector<std::string> idents() {
    std::vector<std::string> out;
    for (const auto& row : model::lignes(session())) out.push_back(row.at("IDENT"));
    return out;
  }
};

TEST_F(AccesTest, StartRunsItsStepsThenListsTheRowsOfTheRequest) {
  ASSERT_TRUE(model::ouvrir(session(), "TEST-MODELE_ACCES"));
  EXPECT_EQ(journal, (std::vector<std::string>{"INIT", "AVANT_DEBUT", "DEBUT", "ACTIVE_REQUETE", "LST_SELECTION A1",
                                               "LST_SELECTION A2", "LST_SELECTION A3", "LST_LISTE_PLEINE"}));
  auto rows = model::lignes(session());
  ASSERT_EQ(rows.size(), 3u);
  EXPECT_EQ(rows[1].at("MIRVAE.NUMCP"), "411002");
  EXPECT_EQ(rows[1].at("VLIBCP2"), "Compte 411002");
  EXPECT_EQ(rows[0].at("DTOPE"), "01/03/2024");
}

TEST_F(AccesTest, RejectedRowsAreDroppedAndAnEmptyListSaysSo) {
  model::ouvrir(session(), "TEST-MODELE_ACCES");
  ASSERT_TRUE(model::saisir(session(), "VFILTRE", "411001"));
  EXPECT_EQ(idents(), std::vector<std::string>{"A2"});
  base().exec("UPDATE MIRVAE SET NUMCP = '411001'");
  journal.clear();
  ASSERT_TRUE(model::saisir(session(), "VFILTRE", "411001"));
  EXPECT_TRUE(idents().empty());
  EXPECT_EQ(journal.back(), "LST_LISTE_VIDE");
  EXPECT_EQ(session().transcript().textes("saisie").back(), "VFILTRE = 411001");
  EXPECT_FALSE(model::appuyer(session(), "GERER"));
  EXPECT_EQ(journal.back(), "LST_LISTE_VIDE");
  EXPECT_EQ(session().transcript().textes("refus"), std::vector<std::string>{"GERER"});
}

TEST_F(AccesTest, AHandlerLeavingAtDebutStopsTheStart) {
  quitAt = "DEBUT";
  EXPECT_FALSE(model::ouvrir(session(), "TEST-MODELE_ACCES"));
  EXPECT_EQ(journal, (std::vector<std::string>{"INIT", "AVANT_DEBUT", "DEBUT"}));
  EXPECT_EQ(session().ecranCourant(), nullptr);
  EXPECT_EQ(session().transcript().textes("ferme"), std::vector<std::string>{"TEST-MODELE_ACCES"});
}

TEST_F(AccesTest, ActionsActOnTheChosenRowAndQueuedProceduresRunAfterThem) {
  model::ouvrir(session(), "TEST-MODELE_ACCES");
  journal.clear();
  ASSERT_TRUE(model::appuyer(session(), "GERER"));
  ASSERT_TRUE(model::choisirLigne(session(), 3));
  ASSERT_TRUE(model::appuyer(session(), "GERER"));
  EXPECT_EQ(journal, (std::vector<std::string>{"GERER A1", "PLUS_TARD", "GERER A3", "PLUS_TARD"}));
  EXPECT_THROW(model::choisirLigne(session(), 4), HostError);
  EXPECT_THROW(model::appuyer(session(), "INCONNUE"), HostError);
}

TEST_F(AccesTest, TheListIsRefreshedWhenTheScreenComesBackInFront) {
  model::ouvrir(session(), "TEST-MODELE_ACCES");
  ASSERT_TRUE(model::ouvrir(session(), "TEST-MODELE_ECRAN"));
  EXPECT_EQ(model::ecranDevant(session()).code(), "TEST-MODELE_ECRAN");
  base().exec("INSERT INTO MIRVAE (IDENT, TYPE, NUMCP, DTOPE) VALUES ('A4', 'FC', '411004', '2024-03-04')");
  journal.clear();
  model::fermer(session());
  EXPECT_EQ(model::ecranDevant(session()).code(), "TEST-MODELE_ACCES");
  EXPECT_EQ(journal.front(), "DEBUT_ACTIVATION");
  EXPECT_EQ(idents(), (std::vector<std::string>{"A1", "A2", "A3", "A4"}));
}

TEST_F(AccesTest, FreeScreenAsksEachControlBeforeItChanges) {
  ASSERT_TRUE(model::ouvrir(session(), "TEST-MODELE_ECRAN"));
  EXPECT_EQ(journal, std::vector<std::string>{"DEBUT"});
  EXPECT_TRUE(model::saisir(session(), "VNOM", "Dupont"));
  journal.resize(6);
  EXPECT_FALSE(model::saisir(session(), "VNOM", "Durand"));
  EXPECT_EQ(model::valeur(session(), "VNOM"), "Dupont");
  EXPECT_EQ(session().transcript().textes("refus"), std::vector<std::string>{"VNOM = Durand"});
  EXPECT_THROW(model::saisir(session(), "INCONNU", "x"), HostError);
}

}  // namespace
