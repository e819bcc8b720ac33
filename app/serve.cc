#include "app/serve.h"

#include <httplib.h>

#include <atomic>
#include <condition_variable>
#include <deque>
#include <functional>
#include <future>
#include <map>
#include <mutex>
#include <nlohmann/json.hpp>
#include <optional>
#include <random>
#include <set>
#include <thread>

#include "app/screen_layouts.h"
#include "app/script.h"
#include "host/automate.h"
#include "host/error.h"
#include "host/session.h"
#include "host/table.h"
#include "host/value.h"
#include "model/acces.h"
#include "model/impression.h"
#include "model/mains.h"
#include "model/sdocum.h"
#include "model/traitecr.h"
#include "registry/dossier.h"

extern const char* const serve_page;

namespace app {

namespace {

using nlohmann::json;

constexpr std::size_t kMaxSessions = 64;
constexpr std::size_t kMaxRequest = 64 * 1024;
constexpr const char* kAnswerMissing = "réponse attendue : ";

// A mistake of the page (a malformed request, an object the screen does not know):
// answered 400 with its reason.
struct BadRequest : host::HostError {
  using HostError::HostError;
};

// A question the page has not answered yet: thrown by the web user to stop the
// action, which the session then undoes whole.
struct AnswerMissing : host::HostError {
  using HostError::HostError;
};

bool isLoopback(const std::string& host) { return host == "127.0.0.1" || host == "::1" || host == "localhost"; }

// The person at the page: answers the screens' questions from the answers the page
// sent with the action, in order; the first question without one stops the action.
class WebUser : public host::UserAgent {
 public:
  void begin(const json& answers) {
    answers_.clear();
    for (const json& a : answers) {
      if (!a.is_object() || !a.contains("sorte") || !a["sorte"].is_string())
        throw BadRequest("réponse mal formée : " + a.dump());
      answers_.push_back(a);
    }
    used_ = 0;
    waiting_.reset();
    drawings_ = json::array();
  }

  bool oui(const std::string& question) override {
    const json* a = next("question", {{"sorte", "question"}, {"texte", question}});
    return a->is_string() && *a == "oui";
  }
  std::string dialogue(const std::string& title, const std::string& text,
                       const std::vector<std::string>& choices) override {
    const json* a = next("dialogue", {{"sorte", "dialogue"}, {"titre", title}, {"texte", text}, {"choix", choices}});
    if (!a->is_string()) throw BadRequest("la réponse à un dialogue est le code d'un choix");
    return a->get<std::string>();
  }
  std::optional<std::string> choisir(const std::string& window, const std::vector<std::string>& rows) override {
    const json* a = next("choix", {{"sorte", "choix"}, {"texte", window}, {"choix", rows}});
    if (a->is_null()) return std::nullopt;
    if (!a->is_string()) throw BadRequest("la réponse à une fenêtre de choix est une clé ou null");
    return a->get<std::string>();
  }
  // A modal screen is not worked from the page yet: it closes as it opened.
  void piloter(host::Session&, host::Automate&) override {}
  // Questions answered before the action was played again are in the session's
  // journal: it asks again only from the first one not answered.
  void actionRecommencee() override {}
  void dessiner(host::Automate& screen, host::Ecran::Dessin dessin) override {
    if (dessin.affichages.empty() && dessin.fonctions.empty()) return;
    json functions = json::array();
    for (const auto& [n, list] : dessin.fonctions) functions.push_back({{"fonction", n}, {"liste", list}});
    drawings_.push_back({{"ecran", screen.code()}, {"affichages", dessin.affichages}, {"fonctions", functions}});
  }

  const std::optional<json>& waiting() const { return waiting_; }
  const json& drawings() const { return drawings_; }

 private:
  const json* next(const std::string& kind, json asked) {
    if (used_ < answers_.size() && answers_[used_]["sorte"] == kind && answers_[used_].contains("valeur"))
      return &answers_[used_++]["valeur"];
    waiting_ = std::move(asked);
    throw AnswerMissing(kAnswerMissing + (*waiting_)["texte"].get<std::string>());
  }

  std::vector<json> answers_;
  std::size_t used_ = 0;
  std::optional<json> waiting_;
  json drawings_ = json::array();
};

// The names of the screen's objects a person acts on, as the hands name them.
std::vector<std::string> fieldsOf(host::Automate& screen) {
  std::vector<std::string> names;
  if (host::Table* main = screen.table(false); main && !main->nom().empty())
    for (const host::Colonne& c : main->colonnes()) names.push_back(main->alias() + "." + c.name);
  for (const host::Donnee* d : screen.variables()) names.push_back(d->nom());
  return names;
}

// The buttons of the screens: the commands of the access lists and the branches the
// screens name as buttons ("B_VALID_DOC", "BT_ANALYTIQUE"). The other branches are
// the events of the screens' cycles and the branches of their objects, run by the
// hands at their moment, never pressed.
std::vector<std::string> actionsOf(host::Automate& screen) {
  static const std::set<std::string> kCommands = {"CREER",      "MODIFIER",   "GERER",      "SUPPRESSION",
                                                  "VISU_PIECE", "IMPR_FICHE", "IMPR_LISTE", "VALID"};
  std::vector<std::string> out;
  for (const std::string& b : screen.branches())
    if (kCommands.count(b) || b.rfind("B_", 0) == 0 || b.rfind("BT_", 0) == 0) out.push_back(b);
  return out;
}

json rowsJson(const std::vector<model::RowText>& rows) {
  json out = json::array();
  for (const auto& row : rows) out.push_back(row);
  return out;
}

// The state of the screens: the stack of open screens, and the one in front with
// its objects as shown, what is forbidden or hidden, its actions and its list.
json screensState(host::Session& session) {
  json state;
  state["pile"] = json::array();
  for (host::Automate* open : session.ecrans()) state["pile"].push_back(open->code());
  host::Automate* front = session.ecranCourant();
  if (!front) {
    state["ecran"] = nullptr;
    return state;
  }
  json screen;
  screen["code"] = front->code();
  screen["focus"] = front->ecran()->focus();
  json objects = json::array();
  for (const std::string& name : fieldsOf(*front)) {
    json object{{"nom", name},
                {"interdit", model::estInterdit(session, name)},
                {"cache", model::estCache(session, name)}};
    if (std::string caption = front->ecran()->titreDe(name); !caption.empty()) object["titre"] = caption;
    try {
      object["valeur"] = model::valeur(session, name);
    } catch (const std::exception&) {
      object["valeur"] = "";
    }
    objects.push_back(std::move(object));
  }
  screen["objets"] = std::move(objects);
  json actions = json::array();
  for (const std::string& a : actionsOf(*front))
    actions.push_back({{"nom", a}, {"interdit", model::estInterdit(session, a)}, {"cache", model::estCache(session, a)}});
  screen["actions"] = std::move(actions);
  if (auto* list = dynamic_cast<model::Scritere*>(front)) {
    screen["liste"] = {{"sorte", "acces"},
                       {"lignes", rowsJson(list->rows())},
                       {"complete", list->complete()},
                       {"choisie", list->selectedRow()}};
  } else if (auto* document = dynamic_cast<model::Sdocum*>(front)) {
    screen["liste"] = {{"sorte", "lignes"}, {"nom", document->listName()}, {"lignes", rowsJson(document->rows())}};
  } else if (auto* list = dynamic_cast<model::FreeList*>(front)) {
    screen["liste"] = {{"sorte", "libre"}, {"nom", list->listName()}, {"lignes", rowsJson(list->rows())}};
  }
  state["ecran"] = std::move(screen);
  return state;
}

std::string text(const json& request, const char* key) {
  if (!request.contains(key) || !request[key].is_string())
    throw BadRequest(std::string("« ") + key + " » manque ou n'est pas un texte");
  return request[key].get<std::string>();
}

int number(const json& request, const char* key) {
  if (!request.contains(key) || !request[key].is_number_integer())
    throw BadRequest(std::string("« ") + key + " » manque ou n'est pas un entier");
  return request[key].get<int>();
}

// Plays one gesture through the user's hands; true when the action was accepted.
bool play(host::Session& s, const json& request) {
  const std::string gesture = text(request, "geste");
  if (gesture == "ouvrir") return model::ouvrir(s, text(request, "module"));
  if (gesture == "fermer") {
    model::fermer(s);
    return true;
  }
  if (gesture == "saisir") return model::saisir(s, text(request, "objet"), text(request, "texte"));
  if (gesture == "appuyer") return model::appuyer(s, text(request, "objet"));
  if (gesture == "choix") return model::ouvrirChoix(s, text(request, "objet"));
  if (gesture == "nouvelle_ligne") return model::nouvelleLigne(s);
  if (gesture == "aller_ligne") return model::allerLigne(s, number(request, "ligne"));
  if (gesture == "valider_ligne") return model::validerLigne(s);
  if (gesture == "supprimer_ligne") return model::supprimerLigne(s);
  if (gesture == "abandonner_ligne") return model::abandonnerLigne(s);
  if (gesture == "choisir_ligne") return model::choisirLigne(s, number(request, "ligne"));
  if (gesture == "lire_plus") {
    auto* list = dynamic_cast<model::Scritere*>(&model::ecranDevant(s));
    if (!list) throw BadRequest("l'écran n'a pas de liste d'accès");
    std::size_t upTo = static_cast<std::size_t>(std::max(1, number(request, "ligne")));
    return s.action([&] { list->readUntil(upTo); });
  }
  throw BadRequest("geste « " + gesture + " » inconnu");
}

// One tab's session, on a thread of its own: the session and the printer belong
// to the thread that made them, and the session's requests play one at a time.
class WebSession {
 public:
  explicit WebSession(const std::string& dossier) {
    std::promise<void> ready;
    auto opened = ready.get_future();
    worker_ = std::thread([this, dossier, ready = std::move(ready)]() mutable { run(dossier, ready); });
    try {
      opened.get();
    } catch (...) {
      worker_.join();
      throw;
    }
  }
  ~WebSession() {
    {
      std::lock_guard lock(mutex_);
      stopping_ = true;
    }
    wake_.notify_one();
    worker_.join();
  }

  // Runs `task` on the session's thread and returns what it returned (or throws
  // what it threw).
  json run(std::function<json(host::Session&, WebUser&)> task) {
    std::packaged_task<json()> job([this, task = std::move(task)] { return task(*session_, user_); });
    auto result = job.get_future();
    {
      std::lock_guard lock(mutex_);
      if (stopping_) throw host::HostError("session fermée");
      tasks_.push_back(std::move(job));
    }
    wake_.notify_one();
    return result.get();
  }

 private:
  void run(const std::string& dossier, std::promise<void>& ready) {
    std::optional<model::DestinationGuard> printing;
    try {
      session_ = std::make_unique<host::Session>(registry::ouvrirDossier(dossier), user_, userName());
      printing.emplace();
      model::Imprimante::courante().versDossier(dossierImpressions(dossier));
    } catch (...) {
      ready.set_exception(std::current_exception());
      return;
    }
    ready.set_value();
    for (;;) {
      std::packaged_task<json()> job;
      {
        std::unique_lock lock(mutex_);
        wake_.wait(lock, [this] { return stopping_ || !tasks_.empty(); });
        if (tasks_.empty()) break;
        job = std::move(tasks_.front());
        tasks_.pop_front();
      }
      job();
    }
    session_->fermerTout();
    session_.reset();
  }

  WebUser user_;
  std::unique_ptr<host::Session> session_;
  std::mutex mutex_;
  std::condition_variable wake_;
  std::deque<std::packaged_task<json()>> tasks_;
  bool stopping_ = false;
  std::thread worker_;
};

// The reply to a gesture: whether it was accepted, the question it waits for, what
// the transcript took since it began, the drawings, the screens' state.
json reply(host::Session& session, WebUser& user, std::size_t from, std::optional<bool> accepted) {
  json out = screensState(session);
  if (accepted) out["accepte"] = *accepted && !user.waiting();
  out["attente"] = user.waiting() ? *user.waiting() : json(nullptr);
  json entries = json::array();
  for (const host::Entree& e : session.transcript().depuis(from)) {
    // The stop of an action waiting for an answer is not an error for the person.
    if (user.waiting() && e.sorte == "erreur" && e.texte.find(kAnswerMissing) != std::string::npos) continue;
    entries.push_back({{"sorte", e.sorte}, {"texte", e.texte}});
  }
  out["journal"] = std::move(entries);
  out["dessins"] = user.drawings();
  return out;
}

void sendJson(httplib::Response& res, int status, const json& body) {
  res.status = status;
  // A text that is not UTF-8 (a hand-edited dossier) is shown with replacement marks.
  res.set_content(body.dump(-1, ' ', false, json::error_handler_t::replace), "application/json; charset=utf-8");
}

}  // namespace

struct Serveur::Impl {
  ServeOptions options;
  httplib::Server http;
  int port = 0;
  std::mutex sessions_mutex;
  std::map<std::string, std::shared_ptr<WebSession>> sessions;
  std::mt19937_64 ids{std::random_device{}()};

  std::shared_ptr<WebSession> find(const std::string& id) {
    std::lock_guard lock(sessions_mutex);
    auto it = sessions.find(id);
    return it == sessions.end() ? nullptr : it->second;
  }

  std::string newId() {
    static const char* digits = "0123456789abcdef";
    std::string id;
    std::uniform_int_distribution<int> pick(0, 15);
    for (int i = 0; i < 24; ++i) id += digits[pick(ids)];
    return id;
  }

  // A page of another site may not drive the screens through the person's browser.
  bool foreignOrigin(const httplib::Request& req) const {
    if (!req.has_header("Origin")) return false;
    std::string origin = req.get_header_value("Origin");
    std::string local = "http://" + options.host + ":" + std::to_string(port);
    std::string named = "http://localhost:" + std::to_string(port);
    return origin != local && origin != named;
  }

  void routes() {
    http.set_payload_max_length(kMaxRequest);
    http.set_pre_routing_handler([this](const httplib::Request& req, httplib::Response& res) {
      if (!foreignOrigin(req)) return httplib::Server::HandlerResponse::Unhandled;
      sendJson(res, 403, {{"erreur", "requête d'une autre origine refusée"}});
      return httplib::Server::HandlerResponse::Handled;
    });
    http.set_exception_handler([](const httplib::Request&, httplib::Response& res, std::exception_ptr ep) {
      std::string why = "erreur inconnue";
      int status = 500;
      try {
        std::rethrow_exception(ep);
      } catch (const BadRequest& e) {
        why = e.what(), status = 400;
      } catch (const host::HostError& e) {
        why = e.what(), status = 400;
      } catch (const json::exception& e) {
        why = std::string("requête mal formée : ") + e.what(), status = 400;
      } catch (const std::exception& e) {
        why = e.what();
      }
      sendJson(res, status, {{"erreur", why}});
    });

    http.Get("/", [](const httplib::Request&, httplib::Response& res) {
      res.set_content(serve_page, "text/html; charset=utf-8");
    });
    http.Get(R"(/api/dispositions/([A-Z0-9_-]+))", [](const httplib::Request& req, httplib::Response& res) {
      if (auto layout = dispositionEcran(req.matches[1])) return res.set_content(*layout, "application/json; charset=utf-8");
      sendJson(res, 404, {{"erreur", "aucune disposition pour « " + std::string(req.matches[1]) + " »"}});
    });
    http.Post("/api/sessions", [this](const httplib::Request&, httplib::Response& res) {
      {
        std::lock_guard lock(sessions_mutex);
        if (sessions.size() >= kMaxSessions) {
          sendJson(res, 503, {{"erreur", "trop de sessions ouvertes : fermez un onglet"}});
          return;
        }
      }
      auto session = std::make_shared<WebSession>(options.dossier);
      std::string id;
      {
        std::lock_guard lock(sessions_mutex);
        id = newId();
        sessions[id] = session;
      }
      json state = session->run([](host::Session& s, WebUser& user) {
        user.begin(json::array());
        return reply(s, user, s.transcript().oubliees() + s.transcript().entrees().size(), std::nullopt);
      });
      state["session"] = id;
      sendJson(res, 201, state);
    });
    http.Get(R"(/api/sessions/([0-9a-f]+))", [this](const httplib::Request& req, httplib::Response& res) {
      auto session = find(req.matches[1]);
      if (!session) return sendJson(res, 404, {{"erreur", "session inconnue"}});
      sendJson(res, 200, session->run([](host::Session& s, WebUser& user) {
        user.begin(json::array());
        return reply(s, user, s.transcript().oubliees() + s.transcript().entrees().size(), std::nullopt);
      }));
    });
    http.Delete(R"(/api/sessions/([0-9a-f]+))", [this](const httplib::Request& req, httplib::Response& res) {
      std::shared_ptr<WebSession> gone;
      {
        std::lock_guard lock(sessions_mutex);
        auto it = sessions.find(req.matches[1]);
        if (it == sessions.end()) return sendJson(res, 404, {{"erreur", "session inconnue"}});
        gone = std::move(it->second);
        sessions.erase(it);
      }
      gone.reset();
      sendJson(res, 200, {{"fermee", true}});
    });
    http.Post(R"(/api/sessions/([0-9a-f]+)/gestes)", [this](const httplib::Request& req, httplib::Response& res) {
      auto session = find(req.matches[1]);
      if (!session) return sendJson(res, 404, {{"erreur", "session inconnue"}});
      json request = json::parse(req.body);
      if (!request.is_object()) throw BadRequest("un geste est un objet JSON");
      json answers = request.contains("reponses") ? request["reponses"] : json::array();
      if (!answers.is_array()) throw BadRequest("« reponses » est une liste");
      sendJson(res, 200, session->run([&](host::Session& s, WebUser& user) {
        user.begin(answers);
        std::size_t from = s.transcript().oubliees() + s.transcript().entrees().size();
        bool accepted = play(s, request);
        return reply(s, user, from, accepted);
      }));
    });
  }
};

Serveur::Serveur(ServeOptions options) : impl_(std::make_unique<Impl>()) {
  if (!isLoopback(options.host) && !options.allowRemote)
    throw host::HostError("l'adresse « " + options.host +
                          " » n'est pas locale : quiconque atteint le port lirait et écrirait les comptes du dossier ; "
                          "--allow-remote pour servir quand même");
  chargerModules();
  registry::ouvrirDossier(options.dossier);  // a dossier that cannot be opened is named now
  impl_->options = std::move(options);
  impl_->routes();
}

Serveur::~Serveur() {
  arreter();
  std::lock_guard lock(impl_->sessions_mutex);
  impl_->sessions.clear();
}

int Serveur::lier() {
  const ServeOptions& o = impl_->options;
  if (o.port == 0) {
    impl_->port = impl_->http.bind_to_any_port(o.host);
  } else if (impl_->http.bind_to_port(o.host, o.port)) {
    impl_->port = o.port;
  } else {
    impl_->port = -1;
  }
  if (impl_->port <= 0) throw host::HostError("le port " + std::to_string(o.port) + " de « " + o.host + " » est pris ou interdit");
  return impl_->port;
}

void Serveur::servir() { impl_->http.listen_after_bind(); }

void Serveur::arreter() { impl_->http.stop(); }

std::string Serveur::adresse() const {
  const std::string& host = impl_->options.host;
  std::string shown = host.find(':') != std::string::npos ? "[" + host + "]" : host;
  return "http://" + shown + ":" + std::to_string(impl_->port) + "/";
}

int servir(const ServeOptions& options, std::ostream& out) {
  Serveur server(options);
  server.lier();
  out << "Ouvrez " << server.adresse() << " dans un navigateur (Ctrl+C pour arrêter).\n";
  out.flush();
  server.servir();
  return 0;
}

}  // namespace app
