// The browser front end served in-process on a free port of a fresh demo dossier,
// driven through its API as the page drives it.
#include "app/serve.h"

#include <gtest/gtest.h>
#include <httplib.h>

#include <algorithm>
#include <chrono>
#include <filesystem>
#include <nlohmann/json.hpp>
#include <thread>

#include "app/script.h"
#include "host/error.h"
#include "tests/support/fixture.h"

namespace {

using nlohmann::json;

class ServeTest : public testing_support::DossierTest {
 protected:
  void SetUp() override {
    DossierTest::SetUp();
    demarrer({.dossier = path_, .port = 0});
  }
  void TearDown() override {
    arreterServeur();
    std::filesystem::remove_all(app::dossierImpressions(path_));
    DossierTest::TearDown();
  }

  void demarrer(app::ServeOptions options) {
    server_ = std::make_unique<app::Serveur>(std::move(options));
    port_ = server_->lier();
    serving_ = std::thread([this] { server_->servir(); });
  }
  void arreterServeur() {
    server_->arreter();
    serving_.join();
    server_.reset();
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

  // Plays gestures that the screens all accept; returns the last reply.
  json jouer(const std::string& id, const std::vector<json>& steps) {
    json state;
    for (const json& step : steps) {
      state = geste(id, step);
      EXPECT_TRUE(state["accepte"]) << step.dump() << " : " << state["journal"].dump();
    }
    return state;
  }

  // Enters a two-line client invoice up to its save, and returns the last reply.
  json saisirFacture(const std::string& id, const std::string& client) {
    return jouer(id, {
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
                     });
  }

  // A supplier invoice's line of wood, 2400 HT, its account spread by the key ATEL,
  // the line chosen for its analytic breakdown.
  void saisirBois(const std::string& id) {
    jouer(id, {
                  {{"geste", "ouvrir"}, {"module", "MIRVAE-ACCES2"}},
                  {{"geste", "appuyer"}, {"objet", "CREER"}},
                  {{"geste", "saisir"}, {"objet", "VLIBCP1"}, {"texte", "Scierie Maurel Frères"}},
                  {{"geste", "nouvelle_ligne"}},
                  {{"geste", "saisir"}, {"objet", "LST_MIRVAL.NUMCP"}, {"texte", "601000"}},
                  {{"geste", "saisir"}, {"objet", "LST_V_HT"}, {"texte", "2400"}},
                  {{"geste", "valider_ligne"}},
                  {{"geste", "aller_ligne"}, {"ligne", 1}},
              });
  }

  std::unique_ptr<app::Serveur> server_;
  int port_ = 0;
  std::thread serving_;
};

TEST_F(ServeTest, AnInvoiceTypedOnThePageIsSavedOnceWhenTheDialogIsAnsweredAndSettledFromTheBank) {
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

  // The client pays at the bank: the receipt's line opens the justification screen
  // inside its validation, worked from the page like any modal screen; the invoice's
  // due date is settled by the saved receipt only.
  const json line = {{"geste", "valider_ligne"}};
  jouer(id, {{{"geste", "fermer"}},
             {{"geste", "ouvrir"}, {"module", "MIRVAE-ACCES4"}},
             {{"geste", "appuyer"}, {"objet", "CREER"}},
             {{"geste", "nouvelle_ligne"}},
             {{"geste", "saisir"}, {"objet", "LST_MIRVAL.NUMCP"}, {"texte", "411001"}},
             {{"geste", "saisir"}, {"objet", "LST_V_HT"}, {"texte", "1746"}}});
  json justifying = geste(id, line);
  EXPECT_EQ(justifying["attente"]["sorte"], "ecran");
  EXPECT_EQ(justifying["attente"]["etat"]["ecran"]["code"], "MIRVAE-GEST_JUS");
  EXPECT_EQ(valeur(justifying["attente"]["etat"], "V_RESTE_A_JUSTIF"), "1746.00");
  json settle = line;
  settle["reponses"] = {{{"sorte", "ecran"},
                         {"gestes",
                          {{{"geste", "aller_ligne"}, {"ligne", 1}},
                           {{"geste", "appuyer"}, {"objet", "BT_MT_REGLEMENT"}},
                           {{"geste", "appuyer"}, {"objet", "VALID"}}}}}};
  json settled = geste(id, settle);
  EXPECT_TRUE(settled["accepte"]) << settled.dump();
  EXPECT_EQ(settled["ecran"]["code"], "MIRVAE-GESTION4");
  const std::string open = "SELECT count(*) FROM ECHEA WHERE UNIQR = 0";
  EXPECT_EQ(sql(open), "1");
  jouer(id, {{{"geste", "appuyer"}, {"objet", "B_VALID_DOC"}, {"reponses", {{{"sorte", "dialogue"}, {"valeur", "1"}}}}}});
  EXPECT_EQ(sql(open), "0");
  EXPECT_EQ(sql("SELECT count(DISTINCT RELET) || ' ' || min(RELET = upper(RELET) AND RELET <> '') FROM MOUVE "
                "WHERE NUMCP = '411001'"),
            "1 1");
  EXPECT_EQ(testing_support::incoherences(base()), std::vector<std::string>{});
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

TEST_F(ServeTest, TheAnalyticBreakdownIsWorkedOnItsModalScreenAndLandsOnlyWithTheSavedInvoice) {
  const json press = {{"geste", "appuyer"}, {"objet", "BT_ANALYTIQUE"}};
  auto nothingInTheDossier = [&] {
    for (const char* table : {"MIRVAE", "MIRVAL", "MIRVAANA", "PIECE", "VTSEC"})
      EXPECT_EQ(sql(std::string("SELECT count(*) FROM ") + table), "0") << table;
  };

  // A tab closed while the breakdown screen waits for the person leaves nothing.
  std::string closed = ouvrirSession();
  saisirBois(closed);
  json partial = press;
  partial["reponses"] = {{{"sorte", "ecran"}, {"gestes", {{{"geste", "aller_ligne"}, {"ligne", 1}}}}}};
  EXPECT_EQ(geste(closed, partial)["attente"]["sorte"], "ecran");
  auto deleted = client().Delete("/api/sessions/" + closed);
  ASSERT_TRUE(deleted);
  EXPECT_EQ(deleted->status, 200);
  nothingInTheDossier();

  // Pressed, the button opens the breakdown spread by the account's key, and the
  // action waits for the gestures made on it; the screen behind is as it was.
  std::string id = ouvrirSession();
  saisirBois(id);
  json waiting = geste(id, press);
  EXPECT_FALSE(waiting["accepte"]);
  EXPECT_EQ(waiting["ecran"]["code"], "MIRVAE-GESTION2");
  EXPECT_EQ(waiting["attente"]["sorte"], "ecran");
  EXPECT_EQ(waiting["attente"]["rang"], 0);
  EXPECT_TRUE(waiting["attente"]["refus"].is_null());
  const json& modal = waiting["attente"]["etat"];
  EXPECT_EQ(modal["pile"].back(), "MIRVAE-GEST_ANA");
  EXPECT_EQ(modal["ecran"]["code"], "MIRVAE-GEST_ANA");
  EXPECT_EQ(modal["ecran"]["liste"]["lignes"].size(), 2u);
  EXPECT_TRUE(std::any_of(modal["ecran"]["actions"].begin(), modal["ecran"]["actions"].end(),
                          [](const json& a) { return a["nom"] == "VALID_DOC"; }));

  // The person shares the wood evenly, one gesture after the other; the page sends
  // what was done on the screen so far, drops a refused gesture, and answers a
  // choice window opened on the screen after the screen's entry.
  const json typed = {{{"geste", "aller_ligne"}, {"ligne", 1}},
                      {{"geste", "saisir"}, {"objet", "LST_V_MTANA"}, {"texte", "1200"}},
                      {{"geste", "valider_ligne"}},
                      {{"geste", "aller_ligne"}, {"ligne", 2}},
                      {{"geste", "saisir"}, {"objet", "LST_V_MTANA"}, {"texte", "1200"}},
                      {{"geste", "valider_ligne"}}};
  const json validate = {{"geste", "appuyer"}, {"objet", "VALID_DOC"}}, close = {{"geste", "fermer"}};
  const json pick = {{"geste", "nouvelle_ligne"}}, window = {{"geste", "choix"}, {"objet", "LST_MIRVAANA_M01.CSECT"}};
  auto onScreen = [](std::vector<json> gestes) { return json{{"sorte", "ecran"}, {"gestes", gestes}}; };
  const struct {
    json reponses;
    std::string attente;                       // what the action then waits for; "" when it ran to its end
    int rang;
    json refus;                                // the gesture refused, null when none
    std::pair<std::string, std::string> shown;  // on the modal screen
    std::string message;                       // in the journal
  } steps[] = {
      {{onScreen({typed[0], typed[1], typed[2], validate})}, "ecran", 0, 3, {"V_RESTE_ANA", "240.00"},
       "Le total ventilé est différent du montant du mouvement"},
      {{onScreen({pick, window})}, "choix", 1, nullptr, {}, ""},
      {{onScreen({pick, window}), {{"sorte", "choix"}, {"valeur", "ADMIN"}}}, "ecran", 0, nullptr,
       {"LST_MIRVAANA_M01.CSECT", "ADMIN"}, ""},
      {{onScreen({typed[0], typed[1], typed[2], typed[3], typed[4], typed[5]})}, "ecran", 0, nullptr,
       {"V_RESTE_ANA", "0.00"}, ""},
      {{onScreen({typed[0], typed[1], typed[2], typed[3], typed[4], typed[5], validate, close})}, "", 0, nullptr, {},
       ""},
  };
  for (const auto& step : steps) {
    json request = press;
    request["reponses"] = step.reponses;
    json r = geste(id, request);
    SCOPED_TRACE(request.dump() + "\n" + r.dump());
    EXPECT_NE(r["journal"].dump().find(step.message), std::string::npos);
    if (step.attente.empty()) {
      EXPECT_TRUE(r["accepte"]);
      EXPECT_TRUE(r["attente"].is_null());
      EXPECT_EQ(r["ecran"]["code"], "MIRVAE-GESTION2");
      continue;
    }
    EXPECT_EQ(r["attente"]["sorte"], step.attente);
    EXPECT_EQ(r["attente"]["rang"], step.rang);
    if (!step.shown.first.empty()) {
      EXPECT_EQ(r["attente"]["refus"], step.refus);
      EXPECT_EQ(valeur(r["attente"]["etat"], step.shown.first), step.shown.second);
    }
    nothingInTheDossier();
  }
  // A modal gesture the screen does not know is the page's mistake.
  json wrong = press;
  wrong["reponses"] = {{{"sorte", "ecran"}, {"gestes", {{{"geste", "saisir"}, {"objet", "NULLE_PART"}, {"texte", "1"}}}}}};
  auto refused = client().Post("/api/sessions/" + id + "/gestes", wrong.dump(), "application/json");
  ASSERT_TRUE(refused);
  EXPECT_EQ(refused->status, 400) << refused->body;

  // Saved, the invoice posts the line's breakdown as the person typed it.
  jouer(id, {{{"geste", "nouvelle_ligne"}},
             {{"geste", "saisir"}, {"objet", "LST_MIRVAL.NUMCP"}, {"texte", "624100"}},
             {{"geste", "saisir"}, {"objet", "LST_V_HT"}, {"texte", "150"}},
             {{"geste", "valider_ligne"}},
             {{"geste", "appuyer"}, {"objet", "B_VALID_DOC"}, {"reponses", {{{"sorte", "dialogue"}, {"valeur", "1"}}}}}});
  EXPECT_EQ(sql("SELECT group_concat(s, ', ') FROM (SELECT CSECT || ' ' || MTADE AS s FROM VTSEC JOIN MOUVE ON "
                "MOUVE.UNIQ = VTSEC.MOUVE_UNIQ WHERE NUMCP = '601000' ORDER BY CSECT)"),
            "ATELIER 1200, CHANTIER 1200");
  EXPECT_EQ(sql("SELECT count(*) FROM PIECE"), "1");
  EXPECT_EQ(testing_support::incoherences(base()), std::vector<std::string>{});
}

TEST_F(ServeTest, APrintOfTheListIsServedAsAPdfToItsOwnSessionOnly) {
  std::string id = ouvrirSession(), other = ouvrirSession();
  geste(id, {{"geste", "ouvrir"}, {"module", "MIRVAE-ACCES1"}});
  json printed = geste(id, {{"geste", "appuyer"}, {"objet", "IMPR_LISTE"}});
  ASSERT_EQ(printed["impressions"].size(), 1u) << printed.dump();
  std::string name = printed["impressions"][0];
  auto pdf = client().Get("/api/sessions/" + id + "/impressions/" + name);
  ASSERT_TRUE(pdf);
  EXPECT_EQ(pdf->status, 200);
  EXPECT_EQ(pdf->get_header_value("Content-Type"), "application/pdf");
  EXPECT_EQ(pdf->body.rfind("%PDF", 0), 0u);

  const std::string dossierName = std::filesystem::path(path_).filename().string();
  const std::pair<std::string, std::string> refused[] = {
      {other, name},                             // another tab's print
      {id, "liste1-999.pdf"},                    // none such
      {id, "../" + dossierName},                 // beside the prints
      {id, "..%2F" + dossierName},
      {id, "%2E%2E%2F%2E%2E%2Fetc%2Fpasswd"},
      {id, ""},
  };
  for (const auto& [session, file] : refused) {
    auto res = client().Get("/api/sessions/" + session + "/impressions/" + file);
    ASSERT_TRUE(res) << file;
    EXPECT_EQ(res->status, 404) << file;
    EXPECT_NE(res->get_header_value("Content-Type"), "application/pdf") << file;
  }
}

TEST_F(ServeTest, ASessionLeftIdleIsClosedAndItsTabToldSo) {
  arreterServeur();
  demarrer({.dossier = path_, .port = 0, .idleLimit = std::chrono::milliseconds(200)});
  std::string id = ouvrirSession();
  std::this_thread::sleep_for(std::chrono::milliseconds(600));
  std::vector<httplib::Result> answers;
  answers.push_back(client().Get("/api/sessions/" + id));
  answers.push_back(client().Post("/api/sessions/" + id + "/gestes", R"({"geste":"fermer"})", "application/json"));
  answers.push_back(client().Delete("/api/sessions/" + id));
  for (const auto& res : answers) {
    ASSERT_TRUE(res);
    EXPECT_EQ(res->status, 404);
    EXPECT_EQ(json::parse(res->body)["erreur"], "session expirée");
  }
  ouvrirSession();
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
      {"ligne en texte", "/api/sessions/" + id + "/gestes", R"({"geste":"aller_ligne","ligne":"1"})", {}, 400},
      {"ligne démesurée", "/api/sessions/" + id + "/gestes", R"({"geste":"aller_ligne","ligne":99999999999999999999})", {}, 400},
      {"ligne décimale", "/api/sessions/" + id + "/gestes", R"({"geste":"choisir_ligne","ligne":1e300})", {}, 400},
      {"réponses pas en liste", "/api/sessions/" + id + "/gestes", R"({"geste":"fermer","reponses":{}})", {}, 400},
      {"réponse d'une sorte inconnue", "/api/sessions/" + id + "/gestes",
       R"({"geste":"fermer","reponses":[{"sorte":"oracle","valeur":"oui"}]})", {}, 400},
      {"réponse qui n'est pas un texte", "/api/sessions/" + id + "/gestes",
       R"({"geste":"fermer","reponses":[{"sorte":"dialogue","valeur":[1]}]})", {}, 400},
      {"gestes d'écran pas en liste", "/api/sessions/" + id + "/gestes",
       R"({"geste":"fermer","reponses":[{"sorte":"ecran","gestes":"fermer"}]})", {}, 400},
      {"geste d'écran mal formé", "/api/sessions/" + id + "/gestes",
       R"({"geste":"fermer","reponses":[{"sorte":"ecran","gestes":[{"geste":"saisir","objet":{"x":1},"texte":""}]}]})",
       {}, 400},
      {"bric-à-brac imbriqué", "/api/sessions/" + id + "/gestes",
       R"({"geste":"fermer","reponses":[{"sorte":"ecran","gestes":[)" + std::string(5000, '[') + std::string(5000, ']') +
           "]}]}",
       {}, 400},
  };
  for (const Case& c : cases) {
    auto res = client().Post(c.path, c.headers, c.body, "application/json");
    ASSERT_TRUE(res) << c.what;
    EXPECT_EQ(res->status, c.status) << c.what << " : " << res->body;
    EXPECT_TRUE(json::parse(res->body).contains("erreur")) << c.what;
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
  EXPECT_EQ(page->get_header_value("X-Frame-Options"), "DENY");
}

}  // namespace
