// One user action, one unit: a failed action puts the session back as it found it,
// and no unit holds the dossier while a person answers a question.
#include "host/session.h"

#include <gtest/gtest.h>

#include <cstdlib>

#include "host/error.h"
#include "host/table.h"
#include "model/mains.h"
#include "model/traitecr.h"
#include "tests/support/fixture.h"

namespace {

using namespace host;

// A screen whose actions change its variable, its record buffer and its screen
// state, then fail or not.
struct EcranDeTest : model::Traitecr {
  Chaine ETAT{"ETAT", "", "", 0, this};
  Table NDOC{this, "", "NDOC", ""};
  Champ NDOC_NOM{"NOM", &NDOC};
  explicit EcranDeTest(Evt* e) : Traitecr(e) {
    addBranch("LIRE", &EcranDeTest::lire);
    addBranch("CASSER", &EcranDeTest::casser);
  }
  void lire(Evt*) {
    ETAT = "lu";
    NDOC.lit(3, NDOC_NOM, '=', "ESSAI");
  }
  void casser(Evt*) {
    ETAT = "cassé";
    NDOC.affecter("DERNIER", Valeur::entier(999));
    NDOC.ecrit();
    ecran()->interdit("LIRE");
    lancerModule("", "TEST", "ECRAN", nullptr);  // a screen opened by the failed action
    throw HostError("panne voulue");
  }
};

// A user who, when asked, has another process write the dossier before answering.
struct UtilisateurOccupe : ReponsesPreparees {
  std::string dossier;
  int questions = 0;
  int autre = -1;  // exit status of the other process
  bool oui(const std::string&) override {
    ++questions;
    // The command-line client waits for no lock: it fails at once if the dossier is held.
    std::string command = "sqlite3 '" + dossier + "' \"INSERT INTO NDOC (NOM, DERNIER) VALUES ('AUTRE', 1)\"";
    autre = std::system(command.c_str());
    return true;
  }
};

class SessionTest : public testing_support::DossierTest {
 protected:
  void SetUp() override {
    DossierTest::SetUp();
    testing_support::moduleDeTest<EcranDeTest>("TEST-ECRAN");
  }
};

TEST_F(SessionTest, FailedActionPutsScreensAndTheirStateBack) {
  base().exec("INSERT INTO NDOC (NOM, DERNIER) VALUES ('ESSAI', 7)");
  ASSERT_TRUE(model::ouvrir(session(), "TEST-ECRAN"));
  auto& ecran = static_cast<EcranDeTest&>(model::ecranDevant(session()));
  ASSERT_TRUE(model::appuyer(session(), "LIRE"));

  EXPECT_FALSE(model::appuyer(session(), "CASSER"));

  EXPECT_EQ(ecran.ETAT.chaine(), "lu");
  EXPECT_EQ(ecran.NDOC.valeur("DERNIER").entier(), 7);
  EXPECT_FALSE(ecran.ecran()->estInterdit("LIRE"));
  EXPECT_EQ(session().ecrans().size(), 1u) << "the screen the failed action opened stays open";
  EXPECT_EQ(sql("SELECT DERNIER FROM NDOC WHERE NOM = 'ESSAI'"), "7");
  // The buffer is the row as it stands: writing it back is not taken for another
  // user's change.
  EXPECT_TRUE(session().action([&] {
    ecran.NDOC.affecter("DERNIER", Valeur::entier(8));
    ecran.NDOC.ecrit();
  }));
  EXPECT_EQ(sql("SELECT DERNIER FROM NDOC WHERE NOM = 'ESSAI'"), "8");
}

TEST_F(SessionTest, RowChangedByAnotherUserSinceReadIsNeitherWrittenNorDeleted) {
  base().exec("INSERT INTO NDOC (NOM, DERNIER) VALUES ('ESSAI', 7)");
  for (bool deletion : {false, true}) {
    SCOPED_TRACE(deletion ? "suppression" : "écriture");
    Table ndoc(nullptr, "", "NDOC", "");
    Champ nom("NOM", &ndoc);
    ASSERT_TRUE(session().action([&] { ndoc.lit(3, nom, '=', "ESSAI"); }));
    std::string other = "sqlite3 '" + path_ + "' \"UPDATE NDOC SET DERNIER = DERNIER + 1 WHERE NOM = 'ESSAI'\"";
    ASSERT_EQ(std::system(other.c_str()), 0);
    std::string after = sql("SELECT DERNIER FROM NDOC WHERE NOM = 'ESSAI'");

    EXPECT_FALSE(session().action([&] {
      if (deletion) {
        ndoc.supprime();
      } else {
        ndoc.affecter("DERNIER", Valeur::entier(100));
        ndoc.ecrit();
      }
    }));

    EXPECT_EQ(sql("SELECT DERNIER FROM NDOC WHERE NOM = 'ESSAI'"), after);
    auto errors = session().transcript().textes("erreur");
    ASSERT_FALSE(errors.empty());
    EXPECT_NE(errors.back().find("modifiée ou supprimée par un autre utilisateur"), std::string::npos) << errors.back();
  }
}

// Whether the action wrote before its question or only read, another process writes
// the dossier while the question is open, and the action then lands whole, on the
// dossier as that process left it, with the question asked once.
TEST_F(SessionTest, NoUnitHoldsTheDossierWhileAQuestionWaits) {
  for (bool writesFirst : {true, false}) {
    SCOPED_TRACE(writesFirst ? "question après une écriture" : "question après une lecture");
    base().exec("DELETE FROM NDOC WHERE NOM IN ('MOI', 'AUTRE')");
    UtilisateurOccupe user;
    user.dossier = path_;
    session().setAgent(user);
    bool ok = session().action([&] {
      if (writesFirst) base().exec("INSERT INTO NDOC (NOM, DERNIER) VALUES ('MOI', 0)");
      std::string seen = sql("SELECT count(*) FROM NDOC WHERE NOM = 'AUTRE'");
      if (!session().demander("Continuer ?")) return;
      if (!writesFirst) base().exec("INSERT INTO NDOC (NOM, DERNIER) VALUES ('MOI', 0)");
      base().exec("UPDATE NDOC SET DERNIER = " + seen + " WHERE NOM = 'MOI'");
    });
    session().setAgent(user_);

    EXPECT_TRUE(ok);
    EXPECT_EQ(user.autre, 0) << "the other process found the dossier locked";
    EXPECT_EQ(user.questions, 1);
    EXPECT_EQ(sql("SELECT count(*) FROM NDOC WHERE NOM = 'MOI'"), "1");
    EXPECT_EQ(sql("SELECT DERNIER FROM NDOC WHERE NOM = 'MOI'"), "1") << "the action read a dossier gone by";
    EXPECT_EQ(session().transcript().textes("question").size(), writesFirst ? 1u : 2u);
  }
}

}  // namespace
