// The browser front end served in-process on a free port of a fresh demo dossier,
// driven through its API as the page drives it.
#include "app/serve.h"

#include <gtest/gtest.h>
#include <httplib.h>

#include <algorithm>
#include <nlohmann/json.hpp>
#include <thread>

#include "host/error.h"
#include "tests/support/fixture.h"

namespace {

using nlohmann::json;

class ServeTest : public testing_support::DossierTest {
 protected:
  void SetUp() override {
    DossierTest::SetUp();
    server_ = std::make_unique<app::Serveur>(app::ServeOptions{.dossier = path_, .port = 0});
    port_ = server_->lier();
    serving_ = std::thread([this] { server_->servir(); });
  }
  void TearDown() override {
    server_->arreter();
    serving_.join();
    server_.reset();
    DossierTest::TearDown();
  }

  httplib::Client client() { return httplib::Client("127.0.0.1", port_); }

  std::string ouvrirSession() {
    auto res = client().Post("/api/sessions");
    EXPECT_TRUE(res && res->status == 201);
    return json::parse(res->body)["session"];
  }

  json geste(const std::string& id, const json& g) {
    auto res = client().Post("/api/sessions/" + id + "/gestes", g.dump(), "application/json");
    EXPECT_TRUE(res) << "pas de réponse";
    if (!res) return json();
    EXPECT_EQ(res->status, 200) << g.dump() << " : " << res->body;
    return json::parse(res->body);
  }

  // The value shown for `name` on the screen in front of a reply.
  static std::string valeur(const json& state, const std::string& name) {
    for (const json& o : state["ecran"]["objets"])
      if (o["nom"] == name) return o["valeur"];
    ADD_FAILURE() << name << " absent de l'écran";
    return "";
  }

  // Enters a two-line client invoice up to its save, and returns the last reply.
  json saisirFacture(const std::string& id, const std::string& client) {
    const json steps[] = {
        {{"geste", "ouvrir"}, {"module", "MIRVAE-ACCES1"}},
        {{"geste", "appuyer"}, {"objet", "CREER"}},
        {{"geste", "saisir"}, {"objet", "VLIBCP1"}, {"texte", client}},
        {{"geste", "nouvelle_ligne"}},
        {{"geste", "saisir"}, {"objet", "LST_MIRVAL.NUMCP"}, {"texte", "706300"}},
        {{"geste", "saisir"}, {"objet", "LST_V_HT"}, {"texte", "1500"}},
        {{"geste", "valider_ligne"}},
        {{"geste", "nouvelle_ligne"}},
        {{"geste", "saisir"}, {"objet", "LST_MIRVAL.NUMCP"}, {"texte", "708500"}},
        {{"geste", "saisir"}, {"objet", "LST_V_HT"}, {"texte", "80,00"}},
        {{"geste", "valider_ligne"}},
    };
    json state;
    for (const json& step : steps) {
      state = geste(id, step);
      EXPECT_TRUE(state["accepte"]) << step.dump() << " : " << state["journal"].dump();
    }
    return state;
  }

  std::unique_ptr<app::Serveur> server_;
  int port_ = 0;
  std::thread serving_;
};

TEST_F(ServeTest, AnInvoiceTypedOnThePageIsSavedOnceWhenTheDialogIsAnsweredAndNotBefore) {
  std::string id = ouvrirSession();
  json state = saisirFacture(id, "Brasserie Lissandre");
  EXPECT_EQ(state["ecran"]["code"], "MIRVAE-GESTION1");
  EXPECT_EQ(state["pile"], json({"MIRVAE-ACCES1", "MIRVAE-GESTION1"}));
  EXPECT_EQ(valeur(state, "V_TOT_TTC"), "1746.00");
  EXPECT_EQ(state["ecran"]["liste"]["lignes"].size(), 2u);
  // The page offers the screen's buttons, never an event of its cycles.
  std::vector<std::string> buttons;
  for (const json& a : state["ecran"]["actions"]) buttons.push_back(a["nom"]);
  EXPECT_NE(std::find(buttons.begin(), buttons.end(), "B_VALID_DOC"), buttons.end());
  EXPECT_EQ(std::find(buttons.begin(), buttons.end(), "VALIDATION"), buttons.end());

  // Unanswered, the save stops at its dialog, shows it, and writes nothing.
  json save = {{"geste", "appuyer"}, {"objet", "B_VALID_DOC"}};
  json waiting = geste(id, save);
  EXPECT_FALSE(waiting["accepte"]);
  ASSERT_TRUE(waiting["attente"].is_object());
  EXPECT_EQ(waiting["attente"]["sorte"], "dialogue");
  for (const json& e : waiting["journal"]) EXPECT_NE(e["sorte"], "erreur") << e.dump();
  EXPECT_EQ(sql("SELECT count(*) FROM PIECE"), "0");
  EXPECT_EQ(sql("SELECT count(*) FROM MIRVAE"), "0");

  // Played again with the answer, it saves and posts the invoice once.
  save["reponses"] = {{{"sorte", "dialogue"}, {"valeur", "1"}}};
  json saved = geste(id, save);
  EXPECT_TRUE(saved["accepte"]) << saved["journal"].dump();
  EXPECT_TRUE(saved["attente"].is_null());
  EXPECT_EQ(sql("SELECT count(*) FROM PIECE"), "1");
  EXPECT_EQ(sql("SELECT MTDEB + 0 = 1746 FROM MOUVE WHERE NUMCP = '411001'"), "1");
  EXPECT_EQ(testing_support::incoherences(base()), std::vector<std::string>{});

  json list = geste(id, {{"geste", "fermer"}});
  EXPECT_EQ(list["ecran"]["code"], "MIRVAE-ACCES1");
  EXPECT_EQ(list["ecran"]["liste"]["lignes"].size(), 1u);
}

TEST_F(ServeTest, TwoTabsEnterInvoicesAtOnceEachInItsOwnSession) {
  std::string first = ouvrirSession(), second = ouvrirSession();
  ASSERT_NE(first, second);
  json a, b;
  std::thread other([&] { b = saisirFacture(second, "Brasserie Lissandre"); });
  a = saisirFacture(first, "Brasserie Lissandre");
  other.join();
  // Each tab shows its own invoice; neither saw the other's lines.
  EXPECT_EQ(a["ecran"]["liste"]["lignes"].size(), 2u);
  EXPECT_EQ(b["ecran"]["liste"]["lignes"].size(), 2u);
  json save = {{"geste", "appuyer"}, {"objet", "B_VALID_DOC"}, {"reponses", {{{"sorte", "dialogue"}, {"valeur", "1"}}}}};
  std::thread saving([&] { b = geste(second, save); });
  a = geste(first, save);
  saving.join();
  EXPECT_TRUE(a["accepte"]) << a["journal"].dump();
  EXPECT_TRUE(b["accepte"]) << b["journal"].dump();
  EXPECT_EQ(sql("SELECT count(DISTINCT NPIES) FROM MIRVAE"), "2");
  EXPECT_EQ(testing_support::incoherences(base()), std::vector<std::string>{});
  // Closing one tab leaves the other as it was.
  auto closed = client().Delete("/api/sessions/" + first);
  ASSERT_TRUE(closed);
  EXPECT_EQ(closed->status, 200);
  auto still = client().Get("/api/sessions/" + second);
  ASSERT_TRUE(still);
  EXPECT_EQ(json::parse(still->body)["ecran"]["code"], "MIRVAE-GESTION1");
}

TEST_F(ServeTest, AForbiddenObjectShownOnThePageCannotBeTypedInto) {
  std::string id = ouvrirSession();
  geste(id, {{"geste", "ouvrir"}, {"module", "MIRVAE-ACCES1"}});
  json state = geste(id, {{"geste", "appuyer"}, {"objet", "CREER"}});
  std::string forbidden;
  for (const json& o : state["ecran"]["objets"])
    if (o["interdit"] && !o["cache"]) forbidden = o["nom"];
  ASSERT_FALSE(forbidden.empty()) << "aucun objet interdit sur l'écran de saisie";
  std::string before = valeur(state, forbidden);
  json typed = geste(id, {{"geste", "saisir"}, {"objet", forbidden}, {"texte", "9"}});
  EXPECT_FALSE(typed["accepte"]);
  EXPECT_EQ(valeur(typed, forbidden), before);
}

TEST_F(ServeTest, AMalformedOrForeignRequestGetsItsReasonNeverACrash) {
  std::string id = ouvrirSession();
  struct Case {
    const char* what;
    std::string path, body;
    httplib::Headers headers;
    int status;
  };
  const Case cases[] = {
      {"JSON illisible", "/api/sessions/" + id + "/gestes", "{geste", {}, 400},
      {"pas un objet", "/api/sessions/" + id + "/gestes", "[1]", {}, 400},
      {"geste inconnu", "/api/sessions/" + id + "/gestes", R"({"geste":"voler"})", {}, 400},
      {"texte manquant", "/api/sessions/" + id + "/gestes", R"({"geste":"saisir","objet":"X"})", {}, 400},
      {"aucun écran", "/api/sessions/" + id + "/gestes", R"({"geste":"appuyer","objet":"CREER"})", {}, 400},
      {"module inconnu", "/api/sessions/" + id + "/gestes", R"({"geste":"ouvrir","module":"NULLE-PART"})", {}, 400},
      {"session inconnue", "/api/sessions/0123/gestes", R"({"geste":"fermer"})", {}, 404},
      {"autre origine", "/api/sessions/" + id + "/gestes", R"({"geste":"fermer"})",
       {{"Origin", "http://ailleurs.example"}}, 403},
      {"requête trop grosse", "/api/sessions/" + id + "/gestes", std::string(200 * 1024, ' '), {}, 413},
  };
  for (const Case& c : cases) {
    auto res = client().Post(c.path, c.headers, c.body, "application/json");
    ASSERT_TRUE(res) << c.what;
    EXPECT_EQ(res->status, c.status) << c.what << " : " << res->body;
    if (c.status != 413) {
      EXPECT_TRUE(json::parse(res->body).contains("erreur")) << c.what;
    }
  }
  // The session still answers.
  json state = geste(id, {{"geste", "ouvrir"}, {"module", "MIRVAE-ACCES1"}});
  EXPECT_TRUE(state["accepte"]);
}

TEST_F(ServeTest, OnlyALoopbackAddressIsBoundUnlessAskedAndThePageIsServed) {
  EXPECT_THROW(app::Serveur(app::ServeOptions{.dossier = path_, .host = "0.0.0.0", .port = 0}), host::HostError);
  EXPECT_NO_THROW(app::Serveur(app::ServeOptions{.dossier = path_, .host = "0.0.0.0", .port = 0, .allowRemote = true}));
  auto page = client().Get("/");
  ASSERT_TRUE(page);
  EXPECT_EQ(page->status, 200);
  EXPECT_NE(page->body.find("/api/sessions"), std::string::npos);
}

}  // namespace
