#include "app/serve.h"

#include <httplib.h>

#include <atomic>
#include <chrono>
#include <condition_variable>
#include <deque>
#include <filesystem>
#include <fstream>
#include <functional>
#include <future>
#include <limits>
#include <map>
#include <mutex>
#include <nlohmann/json.hpp>
#include <optional>
#include <random>
#include <set>
#include <stdexcept>
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
// A request nests no deeper than a gesture with its answers and a modal screen's
// gestures; deeper is junk, refused before it costs anything.
constexpr int kMaxDepth = 8;
constexpr const char* kAnswerMissing = "réponse attendue : ";

// A mistake of the page (a malformed request, an object the screen does not know):
// answered 400 with its reason.
struct BadRequest : host::HostError {
  using HostError::HostError;
};

// Stops the action for an answer the page has not given yet (a question, or the
// gestures of a modal screen); the session then undoes the action whole. Not a
// HostError: no branch of a screen may catch it and carry on.
struct AnswerMissing : std::runtime_error {
  using runtime_error::runtime_error;
};

bool isLoopback(const std::string& host) { return host == "127.0.0.1" || host == "::1" || host == "localhost"; }

std::string text(const json& request, const char* key) {
  if (!request.contains(key) || !request[key].is_string())
    throw BadRequest(std::string("« ") + key + " » manque ou n'est pas un texte");
  return request[key].get<std::string>();
}

int number(const json& request, const char* key) {
  const json* n = request.contains(key) ? &request[key] : nullptr;
  constexpr auto kLeast = std::numeric_limits<int>::min(), kMost = std::numeric_limits<int>::max();
  if (!n || !n->is_number_integer() ||
      (n->is_number_unsigned() ? n->get<std::uint64_t>() > std::uint64_t(kMost)
                               : n->get<std::int64_t>() < kLeast || n->get<std::int64_t>() > kMost))
    throw BadRequest(std::string("« ") + key + " » manque ou n'est pas un entier");
  return n->get<int>();
}

// One gesture of the page, read and checked before anything of it is played.
struct Gesture {
  std::string geste, objet, texte, module;
  int ligne = 0;
};

Gesture gestureOf(const json& request) {
  if (!request.is_object()) throw BadRequest("un geste est un objet JSON");
  Gesture g;
  g.geste = text(request, "geste");
  static const std::set<std::string> kBare = {"fermer",          "nouvelle_ligne",  "valider_ligne",
                                              "supprimer_ligne", "abandonner_ligne"};
  if (g.geste == "ouvrir") {
    g.module = text(request, "module");
  } else if (g.geste == "saisir") {
    g.objet = text(request, "objet");
    g.texte = text(request, "texte");
  } else if (g.geste == "appuyer" || g.geste == "choix") {
    g.objet = text(request, "objet");
  } else if (g.geste == "aller_ligne" || g.geste == "choisir_ligne" || g.geste == "lire_plus") {
    g.ligne = number(request, "ligne");
  } else if (!kBare.count(g.geste)) {
    throw BadRequest("geste « " + g.geste + " » inconnu");
  }
  return g;
}

// An answer the page gives to what the action asks: a question's "oui"/"non", a
// dialog's code, a choice window's key (null: cancelled), or the gestures made so
// far on a modal screen.
struct Answer {
  std::string sorte;
  std::optional<std::string> valeur;
  std::vector<Gesture> gestes;
};

std::vector<Answer> answersOf(const json& request) {
  std::vector<Answer> out;
  if (!request.contains("reponses")) return out;
  const json& given = request["reponses"];
  if (!given.is_array()) throw BadRequest("« reponses » est une liste");
  for (const json& a : given) {
    if (!a.is_object()) throw BadRequest("une réponse est un objet JSON");
    Answer answer;
    answer.sorte = text(a, "sorte");
    if (answer.sorte == "ecran") {
      if (!a.contains("gestes") || !a["gestes"].is_array())
        throw BadRequest("les gestes d'un écran sont une liste");
      for (const json& g : a["gestes"]) {
        if (g.is_object() && g.contains("reponses"))
          throw BadRequest("les réponses d'un geste d'écran suivent son entrée dans « reponses »");
        answer.gestes.push_back(gestureOf(g));
        if (answer.gestes.back().geste == "ouvrir") throw BadRequest("un écran modal n'ouvre pas de module");
      }
    } else if (answer.sorte == "question" || answer.sorte == "dialogue") {
      answer.valeur = text(a, "valeur");
    } else if (answer.sorte == "choix") {
      if (!a.contains("valeur") || !(a["valeur"].is_null() || a["valeur"].is_string()))
        throw BadRequest("la réponse à une fenêtre de choix est une clé ou null");
      if (a["valeur"].is_string()) answer.valeur = a["valeur"].get<std::string>();
    } else {
      throw BadRequest("sorte de réponse « " + answer.sorte + " » inconnue");
    }
    out.push_back(std::move(answer));
  }
  return out;
}

json screensState(host::Session& session);
bool play(host::Session& s, const Gesture& g);

// The person at the page: answers what the action asks from the answers the page
// sent with it, in order; the first thing asked without an answer stops the action,
// and the reply names it ("attente", with its place "rang" among the answers).
class WebUser : public host::UserAgent {
 public:
  void begin(std::vector<Answer> answers) {
    answers_ = std::move(answers);
    used_ = 0;
    played_.clear();
    replayed_ = 0;
    waiting_.reset();
    mistake_.reset();
    drawings_ = json::array();
  }

  bool oui(const std::string& question) override {
    return next("question", {{"sorte", "question"}, {"texte", question}}) == "oui";
  }
  std::string dialogue(const std::string& title, const std::string& text,
                       const std::vector<std::string>& choices) override {
    return next("dialogue", {{"sorte", "dialogue"}, {"titre", title}, {"texte", text}, {"choix", choices}}).value();
  }
  std::optional<std::string> choisir(const std::string& window, const std::vector<std::string>& rows) override {
    return next("choix", {{"sorte", "choix"}, {"texte", window}, {"choix", rows}});
  }

  // Plays on the modal screen the gestures of the entry the page gave for it. When
  // the screen is still open after them, or a gesture was refused, or no entry was
  // given, the action stops: the reply shows the screens as the modal screen left
  // them, for the person to go on from there.
  void piloter(host::Session& session, host::Automate& screen) override {
    if (waiting_) throw AnswerMissing(kAnswerMissing + screen.code());
    std::size_t at = used_;
    if (replayed_ < played_.size()) {
      at = played_[replayed_++];
    } else if (used_ < answers_.size() && answers_[used_].sorte == "ecran") {
      played_.push_back(used_++);
      replayed_ = played_.size();
    } else {
      stopOnScreen(session, screen, at, std::nullopt);
    }
    auto open = [&] {
      auto screens = session.ecrans();
      return std::find(screens.begin(), screens.end(), &screen) != screens.end() && !screen.estTermine();
    };
    const std::vector<Gesture>& gestures = answers_[at].gestes;
    for (std::size_t i = 0; i < gestures.size(); ++i) {
      bool accepted = false;
      try {
        if (!open()) throw BadRequest("geste après la fermeture de l'écran « " + screen.code() + " »");
        accepted = play(session, gestures[i]);
      } catch (const host::HostError& e) {
        // A gesture the screen cannot take (an object it does not know) is the
        // page's mistake, as at the top.
        mistake_ = e.what();
        throw AnswerMissing(kAnswerMissing + screen.code());
      }
      if (!accepted) stopOnScreen(session, screen, at, i);
    }
    if (open()) stopOnScreen(session, screen, at, std::nullopt);
  }
  // The host plays the action again itself (another process wrote): the modal
  // screens get the same entries again, in order; the questions answered are in the
  // session's journal.
  void actionCommencee() override {
    played_.clear();
    replayed_ = 0;
  }
  void actionRecommencee() override { replayed_ = 0; }
  void dessiner(host::Automate& screen, host::Ecran::Dessin dessin) override {
    if (dessin.affichages.empty() && dessin.fonctions.empty()) return;
    json functions = json::array();
    for (const auto& [n, list] : dessin.fonctions) functions.push_back({{"fonction", n}, {"liste", list}});
    drawings_.push_back({{"ecran", screen.code()}, {"affichages", dessin.affichages}, {"fonctions", functions}});
  }

  const std::optional<json>& waiting() const { return waiting_; }
  // A gesture of a modal screen's entry that could not be played: the request
  // was malformed.
  const std::optional<std::string>& mistake() const { return mistake_; }
  const json& drawings() const { return drawings_; }
  // The prints this session made, by file name: the only files it serves.
  std::map<std::string, std::string> prints;

 private:
  std::optional<std::string> next(const std::string& kind, json asked) {
    if (!waiting_ && used_ < answers_.size() && answers_[used_].sorte == kind) return answers_[used_++].valeur;
    if (!waiting_) {
      asked["rang"] = used_;
      waiting_ = std::move(asked);
    }
    throw AnswerMissing(kAnswerMissing + (*waiting_)["sorte"].get<std::string>());
  }

  // The state is taken now, before the action is undone.
  [[noreturn]] void stopOnScreen(host::Session& session, host::Automate& screen, std::size_t rank,
                                 std::optional<std::size_t> refused) {
    waiting_ = json{{"sorte", "ecran"},
                    {"rang", rank},
                    {"etat", screensState(session)},
                    {"refus", refused ? json(*refused) : json(nullptr)}};
    throw AnswerMissing(kAnswerMissing + screen.code());
  }

  std::vector<Answer> answers_;
  std::size_t used_ = 0;
  std::vector<std::size_t> played_;  // the modal entries played since the action began
  std::size_t replayed_ = 0;         // how many of them the action played again
  std::optional<json> waiting_;
  std::optional<std::string> mistake_;
  json drawings_ = json::array();
};

// The names of the screen's objects a person acts on, as the hands name them.
std::vector<std::string> fieldsOf(host::Automate& screen) {
  std::vector<std::string> names;
  if (host::Table* main = screen.table(false); main && !main->nom().empty())
    for (const host::Colonne& c : main->colonnes()) names.push_back(main->alias() + "." + c.name);
  for (const host::Donnee* d : screen.variables()) names.push_back(d->nom());
  // The fields of a document's current line, as its list names them ("LST_MIRVAL.NUMCP").
  if (auto* document = dynamic_cast<model::Sdocum*>(&screen); document && document->lineTable())
    for (const host::Colonne& c : document->lineTable()->colonnes())
      names.push_back(document->listName() + "_" + document->lineTable()->alias() + "." + c.name);
  return names;
}

// The buttons of the screens: the commands of the access lists and of the modal
// screens, and the branches the screens name as buttons ("B_VALID_DOC",
// "BT_ANALYTIQUE"). A document's own validation ("VALID_DOC") is a button where the
// screen names none of its own. The other branches are the events of the screens'
// cycles and the branches of their objects, run by the hands at their moment, never
// pressed.
std::vector<std::string> actionsOf(host::Automate& screen) {
  static const std::set<std::string> kCommands = {"CREER",      "MODIFIER",   "GERER", "SUPPRESSION", "VISU_PIECE",
                                                  "IMPR_FICHE", "IMPR_LISTE", "VALID", "ABAND"};
  std::vector<std::string> out;
  for (const std::string& b : screen.branches())
    if (kCommands.count(b) || b.rfind("B_", 0) == 0 || b.rfind("BT_", 0) == 0) out.push_back(b);
  if (screen.aBranche("VALID_DOC") && !screen.aBranche("B_VALID_DOC")) out.push_back("VALID_DOC");
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
    screen["liste"] = {{"sorte", "lignes"},
                       {"nom", document->listName()},
                       {"lignes", rowsJson(document->rows())},
                       {"courante", document->currentLine()}};
  } else if (auto* list = dynamic_cast<model::FreeList*>(front)) {
    screen["liste"] = {{"sorte", "libre"}, {"nom", list->listName()}, {"lignes", rowsJson(list->rows())}};
  }
  state["ecran"] = std::move(screen);
  return state;
}

// Plays one gesture through the user's hands; true when the action was accepted.
bool play(host::Session& s, const Gesture& g) {
  if (g.geste == "ouvrir") return model::ouvrir(s, g.module);
  if (g.geste == "fermer") {
    model::fermer(s);
    return true;
  }
  if (g.geste == "saisir") return model::saisir(s, g.objet, g.texte);
  if (g.geste == "appuyer") return model::appuyer(s, g.objet);
  if (g.geste == "choix") return model::ouvrirChoix(s, g.objet);
  if (g.geste == "nouvelle_ligne") return model::nouvelleLigne(s);
  if (g.geste == "aller_ligne") return model::allerLigne(s, g.ligne);
  if (g.geste == "valider_ligne") return model::validerLigne(s);
  if (g.geste == "supprimer_ligne") return model::supprimerLigne(s);
  if (g.geste == "abandonner_ligne") return model::abandonnerLigne(s);
  if (g.geste == "choisir_ligne") return model::choisirLigne(s, g.ligne);
  // lire_plus: reads an access list on to that row
  auto* list = dynamic_cast<model::Scritere*>(&model::ecranDevant(s));
  if (!list) throw BadRequest("l'écran n'a pas de liste d'accès");
  std::size_t upTo = static_cast<std::size_t>(std::max(1, g.ligne));
  return s.action([&] { list->readUntil(upTo); });
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
      ++busy_;
    }
    wake_.notify_one();
    struct Done {
      WebSession& s;
      ~Done() {
        std::lock_guard lock(s.mutex_);
        --s.busy_;
        s.last_use_ = std::chrono::steady_clock::now();
      }
    } done{*this};
    return result.get();
  }

  // Whether nobody used the session for longer than `limit` (a request under way
  // uses it).
  bool idle(std::chrono::steady_clock::time_point now, std::chrono::milliseconds limit) {
    std::lock_guard lock(mutex_);
    return busy_ == 0 && now - last_use_ > limit;
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
  int busy_ = 0;  // requests queued or under way
  std::chrono::steady_clock::time_point last_use_ = std::chrono::steady_clock::now();
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
  // The prints the action wrote, landed with it: "fiche1 : FOLDER/fiche1-002.pdf".
  json prints = json::array();
  for (const host::Entree& e : session.transcript().depuis(from)) {
    std::size_t at = e.texte.find(" : ");
    if (e.sorte != "impression" || at == std::string::npos) continue;
    std::string path = e.texte.substr(at + 3);
    std::string name = std::filesystem::path(path).filename().string();
    user.prints[name] = path;
    prints.push_back(name);
  }
  out["impressions"] = std::move(prints);
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
  std::atomic<bool> stopping = false, serving = false;
  std::mutex sessions_mutex;
  std::map<std::string, std::shared_ptr<WebSession>> sessions;
  std::set<std::string> expired;  // ids of sessions closed for being left idle
  std::mt19937_64 ids{std::random_device{}()};

  // Closes the sessions left idle too long. Their ids are remembered (a few
  // thousand at most) so that their tabs are told why.
  void expire() {
    std::vector<std::shared_ptr<WebSession>> gone;
    {
      std::lock_guard lock(sessions_mutex);
      auto now = std::chrono::steady_clock::now();
      for (auto it = sessions.begin(); it != sessions.end();) {
        if (!it->second->idle(now, options.idleLimit)) {
          ++it;
          continue;
        }
        if (expired.size() >= 4096) expired.clear();
        expired.insert(it->first);
        gone.push_back(std::move(it->second));
        it = sessions.erase(it);
      }
    }
    // Closed here, out of the lock: a session's thread ends its work first.
  }

  // The session `id`, or nothing when the reply, a 404, is sent.
  std::shared_ptr<WebSession> find(const std::string& id, httplib::Response& res) {
    expire();
    std::lock_guard lock(sessions_mutex);
    auto it = sessions.find(id);
    if (it != sessions.end()) return it->second;
    sendJson(res, 404, {{"erreur", expired.count(id) ? "session expirée" : "session inconnue"}});
    return nullptr;
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

  static json state(host::Session& s, WebUser& user) {
    user.begin({});
    return reply(s, user, s.transcript().oubliees() + s.transcript().entrees().size(), std::nullopt);
  }

  void routes() {
    http.set_payload_max_length(kMaxRequest);
    // No other site may show the page in a frame of its own (to make the person click
    // on the books unawares), and no answer is read as another type than it says.
    http.set_post_routing_handler([](const httplib::Request&, httplib::Response& res) {
      res.set_header("X-Frame-Options", "DENY");
      res.set_header("Content-Security-Policy", "frame-ancestors 'none'");
      res.set_header("X-Content-Type-Options", "nosniff");
    });
    http.set_pre_routing_handler([this](const httplib::Request& req, httplib::Response& res) {
      if (!foreignOrigin(req)) return httplib::Server::HandlerResponse::Unhandled;
      sendJson(res, 403, {{"erreur", "requête d'une autre origine refusée"}});
      return httplib::Server::HandlerResponse::Handled;
    });
    // What the library answers by itself (a body too large, a path no route takes)
    // gets its reason in JSON too.
    http.set_error_handler(
        httplib::Server::HandlerWithResponse([](const httplib::Request&, httplib::Response& res) {
          if (!res.body.empty()) return httplib::Server::HandlerResponse::Unhandled;
          const char* why = res.status == 413   ? "requête trop grosse (64 Kio au plus)"
                            : res.status == 404 ? "adresse inconnue"
                                                : "requête refusée";
          sendJson(res, res.status, {{"erreur", why}});
          return httplib::Server::HandlerResponse::Handled;
        }));
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
      expire();
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
      json opened = session->run(state);
      opened["session"] = id;
      sendJson(res, 201, opened);
    });
    http.Get(R"(/api/sessions/([0-9a-f]+))", [this](const httplib::Request& req, httplib::Response& res) {
      if (auto session = find(req.matches[1], res)) sendJson(res, 200, session->run(state));
    });
    http.Delete(R"(/api/sessions/([0-9a-f]+))", [this](const httplib::Request& req, httplib::Response& res) {
      auto gone = find(req.matches[1], res);
      if (!gone) return;
      {
        std::lock_guard lock(sessions_mutex);
        sessions.erase(req.matches[1]);
      }
      gone.reset();
      sendJson(res, 200, {{"fermee", true}});
    });
    http.Post(R"(/api/sessions/([0-9a-f]+)/gestes)", [this](const httplib::Request& req, httplib::Response& res) {
      auto session = find(req.matches[1], res);
      if (!session) return;
      json request = json::parse(req.body, [](int depth, json::parse_event_t, json&) {
        if (depth > kMaxDepth) throw BadRequest("requête trop imbriquée");
        return true;
      });
      Gesture gesture = gestureOf(request);
      std::vector<Answer> answers = answersOf(request);
      sendJson(res, 200, session->run([&](host::Session& s, WebUser& user) {
        user.begin(std::move(answers));
        std::size_t from = s.transcript().oubliees() + s.transcript().entrees().size();
        bool accepted = play(s, gesture);
        if (user.mistake()) throw BadRequest(*user.mistake());
        return reply(s, user, from, accepted);
      }));
    });
    // A print of the session, by the plain name a reply gave it; nothing else.
    http.Get(R"(/api/sessions/([0-9a-f]+)/impressions/(.*))", [this](const httplib::Request& req,
                                                                     httplib::Response& res) {
      auto session = find(req.matches[1], res);
      if (!session) return;
      std::string name = req.matches[2];
      json found = session->run([&](host::Session&, WebUser& user) {
        auto it = user.prints.find(name);
        return it == user.prints.end() ? json(nullptr) : json(it->second);
      });
      std::ifstream file(found.is_string() ? found.get<std::string>() : std::string(), std::ios::binary);
      if (!found.is_string() || !file) return sendJson(res, 404, {{"erreur", "impression inconnue : " + name}});
      std::string content((std::istreambuf_iterator<char>(file)), std::istreambuf_iterator<char>());
      res.set_content(std::move(content), "application/pdf");
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

void Serveur::servir() {
  impl_->serving = true;
  if (!impl_->stopping) impl_->http.listen_after_bind();
  impl_->serving = false;
}

void Serveur::arreter() {
  impl_->stopping = true;
  // The server only stops once it listens: one asked to stop as it starts would
  // otherwise listen for ever.
  while (impl_->serving && !impl_->http.is_running()) std::this_thread::sleep_for(std::chrono::milliseconds(1));
  impl_->http.stop();
}

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
