#include "host/automate.h"

#include <gtest/gtest.h>

#include "host/error.h"
#include "host/registry.h"
#include "host/session.h"
#include "model/traitmnt.h"
#include "tests/support/fixture.h"

namespace {

using namespace host;

std::vector<std::string> journal;

// A callee that writes its reference parameter and reports through its result.
struct Appele : model::Traitmnt {
  Chaine SORTIE{"SORTIE", "", "", 0, this};
  explicit Appele(Evt* e) : Traitmnt(e) {
    addBranch("ECRIRE", &Appele::ecrire);
    addBranch("DEBUT", &Appele::debut);
    addBranch("FAIRE", &Appele::faire);
  }
  void ecrire(Evt* e) {
    e->param(0, SORTIE, 1);
    SORTIE = "écrit par l'appelé";
    erreurMethode(1, e);
  }
  void debut(Evt*) override { journal.push_back("appelé DEBUT"); }
  void faire(Evt*) override { journal.push_back("appelé FAIRE"); }
};

struct Lanceur : model::Traitmnt {
  Chaine VALEUR{"VALEUR", "", "", 0, this};
  explicit Lanceur(Evt* e) : Traitmnt(e) {
    addBranch("AGIR", &Lanceur::agir);
    addBranch("PLUS_TARD", &Lanceur::plus_tard);
    addBranch("CASSER", &Lanceur::casser);
  }
  void agir(Evt*) {
    lancerProcedure("", "", "", "PLUS_TARD", nullptr, 0);
    journal.push_back("agir fin");
  }
  void plus_tard(Evt*) { journal.push_back("plus tard"); }
  void casser(Evt*) { throw HostError("panne voulue"); }
};

class AutomateTest : public testing_support::DossierTest {
 protected:
  void SetUp() override {
    DossierTest::SetUp();
    journal.clear();
    testing_support::moduleDeTest<Appele>("TEST-APPELE");
    testing_support::moduleDeTest<Lanceur>("TEST-LANCEUR");
    lanceur_ = Registre::instance().creer("TEST-LANCEUR", nullptr);
  }
  void TearDown() override {
    lanceur_.reset();
    DossierTest::TearDown();
  }
  AutomatePtr lanceur_;
};

// A reference parameter is the caller's variable; a value parameter, a copy of it.
TEST_F(AutomateTest, TheCalleeWritesThroughAReferenceParameterAndNeverThroughAValue) {
  auto& l = static_cast<Lanceur&>(*lanceur_);
  l.VALEUR = "original";
  EvtParamVal byValue(1, &l.VALEUR);
  l.appelerProcedure("*", "TEST", "APPELE", "ECRIRE", &byValue, -1);
  EXPECT_EQ(l.VALEUR, "original");
  EvtParamRef byReference(1, &l.VALEUR);
  l.appelerProcedure("*", "TEST", "APPELE", "ECRIRE", &byReference, -1);
  EXPECT_EQ(l.VALEUR, "écrit par l'appelé");
  EXPECT_EQ(l.erreurMethode(), 1);
}

TEST_F(AutomateTest, QueuedProcedureRunsAfterItsCallersHandler) {
  session().action([&] { lanceur_->executer("AGIR", nullptr); });
  EXPECT_EQ(journal, (std::vector<std::string>{"agir fin", "plus tard"}));
}

TEST_F(AutomateTest, ModuleCalledByNameRunsToItsEnd) {
  session().action([&] { lanceur_->appelerModule("", "TEST", "APPELE", nullptr); });
  EXPECT_EQ(journal, (std::vector<std::string>{"appelé DEBUT", "appelé FAIRE"}));
  EXPECT_EQ(session().transcript().textes("ferme"), std::vector<std::string>{"TEST-APPELE"});
}

TEST_F(AutomateTest, HostErrorIsStampedWithItsEventAndUndoesTheAction) {
  bool ok = session().action([&] {
    base().exec("INSERT INTO NDOC (NOM, DERNIER) VALUES ('ESSAI', 1)");
    lanceur_->executer("CASSER", nullptr);
  });
  EXPECT_FALSE(ok);
  ASSERT_EQ(session().transcript().textes("erreur").size(), 1u);
  EXPECT_EQ(session().transcript().textes("erreur")[0], "CASSER : panne voulue");
  EXPECT_EQ(sql("SELECT count(*) FROM NDOC WHERE NOM = 'ESSAI'"), "0");
}

TEST_F(AutomateTest, ActionsInsideAnotherAnswerForThemselvesAndAFailureUndoesTheWhole) {
  std::vector<bool> inner;
  bool ok = session().action([&] {
    base().exec("INSERT INTO NDOC (NOM, DERNIER) VALUES ('ESSAI', 1)");
    inner.push_back(session().action([&] { lanceur_->executer("CASSER", nullptr); }));
    inner.push_back(session().action([&] { lanceur_->executer("AGIR", nullptr); }));
  });
  EXPECT_EQ(inner, (std::vector<bool>{false, true}));
  EXPECT_FALSE(ok);
  EXPECT_EQ(sql("SELECT count(*) FROM NDOC WHERE NOM = 'ESSAI'"), "0");
}

TEST_F(AutomateTest, BadNamesAndIndexesAreClearErrors) {
  EXPECT_THROW(lanceur_->executer("INCONNUE", nullptr), HostError);
  EXPECT_THROW(Registre::instance().creer("MIRVAE-NEANT", nullptr), HostError);
  EXPECT_THROW(lanceur_->lancerProcedure("", "", "", "INCONNUE", nullptr, 0), HostError);
  EvtParamVal evt(1, "seul");
  Chaine c("C", "", "", 0, nullptr);
  try {
    evt.param(1, c, 0);
    FAIL();
  } catch (const HostError& e) {
    EXPECT_NE(std::string(e.what()).find("paramètre 1"), std::string::npos);
  }
}

// A long session keeps only its recent entries, numbered from its first one, so that
// a reader who noted where it stopped finds its place again; emptying keeps counting.
TEST(Transcript, KeepsTheRecentEntriesUnderTheirNumbers) {
  Transcript transcript;
  const std::size_t total = 2 * Transcript::kGardees + 5;
  for (std::size_t n = 0; n < total; ++n) transcript.ajouter("action", std::to_string(n));
  const auto& kept = transcript.entrees();
  EXPECT_GE(kept.size(), Transcript::kGardees);
  EXPECT_LT(kept.size(), 2 * Transcript::kGardees);
  EXPECT_EQ(transcript.oubliees() + kept.size(), total);
  EXPECT_EQ(kept.front().texte, std::to_string(transcript.oubliees()));
  EXPECT_EQ(kept.back().texte, std::to_string(total - 1));
  transcript.vider();
  transcript.ajouter("message", "après");
  EXPECT_EQ(transcript.oubliees(), total);
  EXPECT_EQ(transcript.textes("message"), std::vector<std::string>{"après"});
}

struct Casse : model::Traitmnt {
  explicit Casse(Evt* e) : Traitmnt(e) { throw std::runtime_error("constructeur en échec"); }
};

class FabriqueTest : public testing_support::DossierTest {};

TEST_F(FabriqueTest, AllocationFailureGivesNullAndConstructorFailurePassesThrough) {
  refuserAllocations(1);
  EXPECT_EQ(fabriquer<Appele>(nullptr), nullptr);
  EXPECT_THROW(fabriquer<Casse>(nullptr), std::runtime_error);  // ASan proves the memory was released
  auto* a = const_cast<Automate*>(fabriquer<Appele>(nullptr));
  ASSERT_NE(a, nullptr);
  DetruireAutomate{}(a);
}

}  // namespace
