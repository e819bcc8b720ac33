// Session scripts played in-process on a fresh demo dossier, on small screens of the
// tests' own: actions, expectations, answers to questions, modal screens, and the
// failures that must stop a script at its line.
#include "app/script_player.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <sstream>

#include "app/script.h"
#include "host/clock.h"
#include "host/error.h"
#include "host/registry.h"
#include "host/table.h"
#include "model/acces.h"
#include "model/traitecr.h"
#include "registry/dossier.h"
#include "tests/support/fixture.h"

namespace {

using namespace host;

// A free screen that greets, refuses, asks and calls a modal screen.
struct EcranEssai : model::Traitecr {
  Chaine VNOM{"VNOM", "", "", 0, this};
  explicit EcranEssai(Evt* e) : Traitecr(e) {
    addBranch("VNOM", &EcranEssai::vnom);
    addBranch("DEMANDER", &EcranEssai::demander);
    addBranch("DIALOGUER", &EcranEssai::dialoguer);
    addBranch("CHOISIR", &EcranEssai::choisir);
    addBranch("MODALE", &EcranEssai::modale);
    addBranch("ECHOUER", &EcranEssai::echouer);
  }
  void vnom(Evt* e) {
    if (VNOM == "personne") {
      rejeter(e);
      return;
    }
    BoiteMessage("Bonjour " + VNOM.chaine(), 0, nullptr);
  }
  void demander(Evt*) {
    // Written before the question: undone when the question is left unanswered.
    session().base().exec("UPDATE PARAM SET PRE18 = 'X' WHERE PNUME = 1");
    BoiteMessage(session().demander("Continuer ?") ? "suite" : "arrêt", 0, nullptr);
  }
  void dialoguer(Evt*) {
    BoiteMessage("code " + BoiteDialogue("Enregistrement", "Que faire ?", 0, {"1~Enregistrer", "2~Abandonner"}), 0,
                 nullptr);
  }
  void choisir(Evt*) {
    auto pick = session().choisir("Comptes", {"411001", "411002"});
    BoiteMessage(pick ? "choisi " + *pick : std::string("abandon"), 0, nullptr);
  }
  void modale(Evt*) {
    appelerModule("", "ESSAI", "MODALE", nullptr);
    BoiteMessage("retour", 0, nullptr);
  }
  void echouer(Evt*) { throw HostError("panne voulue"); }
};

struct EcranModal : model::Traitecr {
  Chaine VVAL{"VVAL", "", "", 0, this};
  explicit EcranModal(Evt* e) : Traitecr(e) { addBranch("VVAL", &EcranModal::vval); }
  void vval(Evt*) { BoiteMessage("modale " + VVAL.chaine(), 0, nullptr); }
};

// The dossier's bank accounts, a list to select in.
struct ListeBanques : model::Acces2 {
  Champ NUMCP{this, "NUMCP", table(false)};
  explicit ListeBanques(Evt* e) : Acces2(e) {
    nomTable("COMPT", nullptr);
    addBranch("ACTIVE_REQUETE", &ListeBanques::active_requete);
    addBranch("VOIR", &ListeBanques::voir);
  }
  void active_requete(Evt* e) override {
    Scritere::active_requete(e);
    table(false)->initRequete();
    table(false)->ajouteFiltre(NUMCP, '/', "512");
    table(false)->activeRequete();
  }
  void voir(Evt*) { BoiteMessage("Compte " + NUMCP.chaine(), 0, nullptr); }
};

void enregistrerEcrans() {
  static const Module essai("", "ESSAI-SCRIPT", &fabriquer<EcranEssai>, false, "");
  static const Module modale("", "ESSAI-MODALE", &fabriquer<EcranModal>, false, "");
  static const Module banques("", "ESSAI-BANQUES", &fabriquer<ListeBanques>, false, "");
}

class ScriptPlayerTest : public testing_support::DossierTest {
 protected:
  void SetUp() override {
    DossierTest::SetUp();
    enregistrerEcrans();
  }
  // Plays `text` as the script "essai.txt"; the output is kept in out_.
  int jouer(const std::string& text) {
    std::istringstream in(text);
    std::ostringstream out;
    int rc = app::jouer(path_, in, "essai.txt", out);
    out_ = out.str();
    return rc;
  }
  std::string out_;
};

TEST_F(ScriptPlayerTest, ASessionThatHoldsItsExpectationsPrintsTheTranscriptAndSucceeds) {
  int rc = jouer(R"(# saluer, puis se faire refuser
open ESSAI-SCRIPT
expect screen ESSAI-SCRIPT
say "-- salut"
type VNOM "Ana Lopès"
expect accepted
expect message "Bonjour Ana Lopès"
expect message containing Ana
expect value VNOM "Ana Lopès"
expect no error
type VNOM personne
expect refused
expect refused VNOM
expect value VNOM "Ana Lopès"
press ECHOUER
expect error containing "panne voulue"
expect sql "SELECT count(*) FROM COMPT WHERE NUMCP LIKE '512%'" = 2
expect sql "SELECT PDDEX FROM PARAM WHERE PNUME = 1" != ""
close
)");
  EXPECT_EQ(rc, 0) << out_;
  for (const char* shown : {"[ouvre] ESSAI-SCRIPT", "-- salut", "[message] Bonjour Ana Lopès", "[refus]",
                            "[erreur]", "[ferme] ESSAI-SCRIPT"})
    EXPECT_NE(out_.find(shown), std::string::npos) << shown << "\n" << out_;
  // Printed as it went: the narration comes before what followed it.
  EXPECT_LT(out_.find("[ouvre] ESSAI-SCRIPT"), out_.find("-- salut"));
  EXPECT_LT(out_.find("-- salut"), out_.find("[message] Bonjour"));
}

// Expectations on the last action, the messages, the dossier, a list and inside a
// modal screen: each failing one stops the script at its line, saying why.
TEST_F(ScriptPlayerTest, AScriptStopsAtTheLineThatFailsSayingWhy) {
  struct Case {
    std::string script, why, where = "";
  };
  // After greeting Ana, line 4 fails.
  auto afterAna = [](const std::string& line, const std::string& why) {
    return Case{"open ESSAI-SCRIPT\ntype VNOM Ana\n\n" + line + "\n", why, "essai.txt:4: " + line + " : "};
  };
  const Case cases[] = {
      afterAna("expect message \"Bonjour Bob\"",
               "aucun message « Bonjour Bob » depuis la dernière action ; messages : « Bonjour Ana »"),
      afterAna("expect message containing Bob", "aucun message contenant « Bob »"),
      afterAna("expect error containing panne",
               "aucune erreur contenant « panne » depuis la dernière action ; aucune erreur montrée"),
      afterAna("expect question Q", "aucune question « Q »"),
      afterAna("expect value VNOM Bob", "VNOM vaut « Ana », attendu « Bob »"),
      afterAna("expect refused", "la dernière action a été acceptée"),
      afterAna("expect screen ESSAI-MODALE", "l'écran devant est « ESSAI-SCRIPT »"),
      afterAna("expect sql \"SELECT count(*) FROM PIECE\" = 99", "la requête donne « 0 », attendu « 99 »"),
      afterAna("expect sql \"SELECT 1\" != 1.0", "la requête donne « 1 »"),
      afterAna("expect sql \"DELETE FROM COMPT\" = 0", "une requête de script ne fait que lire le dossier"),
      afterAna("expect sql \"SELECT 1; DELETE FROM COMPT\" = 1", "une seule requête par ligne"),
      afterAna("expect sql \"SELECT nothing FROM nowhere\" = 1", "requête refusée par la base"),
      afterAna("type VINCONNU x", "VINCONNU"),
      {"open ESSAI-SCRIPT\npress ECHOUER\nexpect accepted\n",
       "essai.txt:3: expect accepted : la dernière action a été refusée : « ECHOUER : panne voulue »"},
      {"open ESSAI-SCRIPT\npress ECHOUER\nexpect refused\n",
       "essai.txt:3: expect refused : la dernière action a échoué sans refus : « "},
      {"expect accepted\n", "essai.txt:1: expect accepted : aucune action n'a encore été jouée"},
      {"open ESSAI-SCRIPT\ntype VNOM personne\nexpect refused VNOMS\n", "aucun refus sur VNOMS"},
      {"open ESSAI-SCRIPT\npress MODALE\nexpect value VVAL y\nclose\n",
       "essai.txt:3: expect value VVAL y : VVAL vaut «  », attendu « y »"},
      {"open ESSAI-BANQUES\nexpect row 3 NUMCP 512300\n",
       "essai.txt:2: expect row 3 NUMCP 512300 : la liste n'a que 2 lignes"},
      {"open ESSAI-BANQUES\nexpect row 1 NUMCPX 512100\n", "pas de colonne NUMCPX ; colonnes : "},
      {"open ESSAI-BANQUES\nexpect row containing 411\n", "aucune des 2 lignes de la liste ne contient « 411 »"},
  };
  for (const Case& c : cases) {
    EXPECT_EQ(jouer(c.script + "say \"jamais joué\"\n"), 1) << c.script;
    EXPECT_NE(out_.find(c.why), std::string::npos) << c.script << "\n" << out_;
    EXPECT_NE(out_.find(c.where), std::string::npos) << c.script << "\n" << out_;
    EXPECT_EQ(out_.find("jamais joué"), std::string::npos) << c.script;
  }
  // A script query never changed the dossier.
  EXPECT_NE(sql("SELECT count(*) FROM COMPT"), "0");
}

TEST_F(ScriptPlayerTest, ATypedTextThatIsNotCleanUtf8IsRefusedAndTheValueKept) {
  const std::pair<const char*, const char*> cases[] = {
      {"Ana\rLopès", "caractère de contrôle U+000D en position 4"},
      {"Ana L\xF3pez", "octet 0xF3 hors UTF-8 en position 6"},
  };
  for (const auto& [typed, why] : cases) {
    int rc = jouer("open ESSAI-SCRIPT\ntype VNOM Ana\ntype VNOM \"" + std::string(typed) +
                   "\"\nexpect refused VNOM\nexpect message \"texte refusé pour VNOM : " + why +
                   "\"\nexpect value VNOM Ana\ntype VNOM \"Zoë 🍺\"\nexpect accepted\n");
    EXPECT_EQ(rc, 0) << out_;
  }
}

// Statements that read nothing yet change a connection or the dossier: each is refused,
// and the session's next action, another connection's write and the journal mode
// are as they were.
TEST_F(ScriptPlayerTest, AScriptQueryCannotChangeTheSessionNorTheDossier) {
  const std::string attached = testing_support::cheminTemporaire("mirvae-attach");
  const std::vector<std::string> queries = {
      "BEGIN", "BEGIN IMMEDIATE", "SAVEPOINT s", "ATTACH '" + attached + "' AS autre",
      "PRAGMA locking_mode = EXCLUSIVE", "PRAGMA synchronous = OFF", "PRAGMA journal_mode = DELETE",
      "PRAGMA query_only = OFF",
      // What a query needs is let through.
      "WITH RECURSIVE n(i) AS (SELECT 1 UNION ALL SELECT i + 1 FROM n WHERE i < 3) "
      "SELECT count(*) FROM n JOIN COMPT ON NUMCP = '411001' WHERE i = 2"};
  for (const std::string& query : queries) {
    SCOPED_TRACE(query);
    std::istringstream text("open ESSAI-SCRIPT\nexpect sql \"" + query + "\" = 1\n");
    std::ostringstream out;
    app::ScriptPlayer player(app::parseScript(text), out);
    Session played(registry::ouvrirDossier(path_), player, "essai");
    bool reads = query.rfind("WITH", 0) == 0;
    try {
      player.play(played);
      EXPECT_TRUE(reads) << out.str();
    } catch (const app::ScriptError& e) {
      EXPECT_FALSE(reads) << e.what();
      EXPECT_STREQ(e.what(), "une requête de script ne fait que lire le dossier");
    }
    EXPECT_TRUE(played.action([&] { played.base().exec("UPDATE PARAM SET PRE18 = 'X' WHERE PNUME = 1"); }));
    base().exec("UPDATE PARAM SET PRE18 = 'O' WHERE PNUME = 1");
    EXPECT_EQ(sql("PRAGMA journal_mode"), "wal");
    EXPECT_FALSE(std::filesystem::exists(attached));
  }
}

TEST_F(ScriptPlayerTest, AnswersAreTakenInOrderAsQuestionsCome) {
  int rc = jouer(R"(open ESSAI-SCRIPT
answer yes
answer dialog 2
answer no
answer pick 411002
answer cancel
press DEMANDER
expect message suite
press DIALOGUER
expect message "code 2"
press DEMANDER
expect question "Continuer ?"
expect message arrêt
press CHOISIR
expect message "choisi 411002"
press CHOISIR
expect message abandon
)");
  EXPECT_EQ(rc, 0) << out_;
  EXPECT_NE(out_.find("[question] Continuer ?\n[réponse] oui"), std::string::npos) << out_;
  EXPECT_NE(out_.find("[choix] Comptes\n[réponse] (abandon)"), std::string::npos) << out_;
  // An answer no question took fails the script at the answer.
  EXPECT_EQ(jouer("open ESSAI-SCRIPT\nanswer yes\nanswer no\npress DEMANDER\nclose\n"), 1);
  EXPECT_NE(out_.find("essai.txt:3: answer no : réponse jamais demandée"), std::string::npos) << out_;
}

TEST_F(ScriptPlayerTest, AQuestionWithoutItsAnswerFailsLoudlyAndUndoesTheAction) {
  struct Case {
    const char* answers;
    const char* press;
    const char* why;
  };
  const Case cases[] = {
      {"", "DEMANDER", "aucune réponse donnée à la question « Continuer ? »"},
      {"answer pick 411001\n", "DEMANDER",
       "la question « Continuer ? » attend oui ou non, la réponse suivante est « answer pick 411001 » (ligne 2)"},
      {"answer dialog 3\n", "DIALOGUER", "le dialogue « Enregistrement : Que faire ? » n'offre pas la réponse « 3 » ; choix : « 1~Enregistrer »"},
      {"answer pick 411999\n", "CHOISIR", "« 411999 » ne figure pas dans la fenêtre de choix « Comptes »"},
      {"answer yes\n", "CHOISIR", "la fenêtre de choix « Comptes » attend un choix ou un abandon"},
  };
  for (const auto& c : cases) {
    std::string script = std::string("open ESSAI-SCRIPT\n") + c.answers + "press " + c.press + "\nsay \"jamais joué\"\n";
    int line = c.answers[0] ? 3 : 2;
    EXPECT_EQ(jouer(script), 1) << script;
    EXPECT_NE(out_.find("essai.txt:" + std::to_string(line) + ": press " + c.press + " : " + c.why), std::string::npos)
        << out_;
    EXPECT_NE(out_.find("[erreur]"), std::string::npos) << out_;
    EXPECT_EQ(out_.find("jamais joué"), std::string::npos);
  }
  // What the action wrote before the question is gone.
  EXPECT_EQ(sql("SELECT PRE18 FROM PARAM WHERE PNUME = 1"), "O");
}

TEST_F(ScriptPlayerTest, AModalScreenPlaysTheFollowingLinesUntilItCloses) {
  int rc = jouer(R"(open ESSAI-SCRIPT
press MODALE
expect screen ESSAI-MODALE
type VVAL x
expect message "modale x"
close
expect screen ESSAI-SCRIPT
expect accepted
expect message "modale x"
expect message retour
type VNOM Léa
expect message "Bonjour Léa"
)");
  EXPECT_EQ(rc, 0) << out_;
  auto at = [&](const char* s) { return out_.find(s); };
  EXPECT_LT(at("[ouvre] ESSAI-MODALE"), at("[message] modale x"));
  EXPECT_LT(at("[message] modale x"), at("[ferme] ESSAI-MODALE"));
  EXPECT_LT(at("[ferme] ESSAI-MODALE"), at("[message] retour"));
  EXPECT_LT(at("[message] retour"), at("[message] Bonjour Léa"));
}

TEST_F(ScriptPlayerTest, TheListIsCountedSearchedAndSelected) {
  int rc = jouer(R"(open ESSAI-BANQUES
expect rows 2
expect row containing "compte projets"
expect row 2 NUMCP 512200
select 2
press VOIR
expect message "Compte 512200"
)");
  EXPECT_EQ(rc, 0) << out_;
}

TEST_F(ScriptPlayerTest, TodaySetsTheHostClock) {
  EXPECT_EQ(jouer("today 01/02/2025 08:15\n"), 0) << out_;
  EXPECT_EQ(jourTexte(clock::today()), "01/02/2025");
  EXPECT_EQ(clock::timeOfDay(), "08:15:00");
}

TEST_F(ScriptPlayerTest, ALineThatCannotBeUnderstoodStopsTheScriptBeforeAnythingIsPlayed) {
  EXPECT_EQ(jouer("open ESSAI-SCRIPT\ntype VNOM Ana\npresse OK\n"), 1);
  EXPECT_NE(out_.find("essai.txt:3: presse OK : instruction inconnue « presse »"), std::string::npos) << out_;
  EXPECT_EQ(out_.find("[ouvre]"), std::string::npos) << out_;
}

}  // namespace
