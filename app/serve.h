// The browser front end: a local web server that shows the screens of a dossier to
// a person, through the same user's hands as the scripts (model/mains.h).
//
// One browser tab is one user session: its own host::Session on the dossier, with
// its automata, work tables and transcript, opened when the page starts and named
// by the id the page then sends with every request. A session lives on a thread of
// its own (the session and the printer are the thread's), and its requests are
// played there one after the other; sessions run side by side.
//
// The API (JSON):
//   POST   /api/sessions                      opens a session; answers its id and state
//   GET    /api/sessions/ID                   the state of the screens
//   POST   /api/sessions/ID/gestes            one user action: {"geste": ..., ...}
//   DELETE /api/sessions/ID                   closes the session
//   GET    /api/sessions/ID/impressions/FILE  a print of the session (application/pdf)
// A gesture is "ouvrir" (module), "fermer", "saisir" (objet, texte), "appuyer"
// (objet), "choix" (objet), "nouvelle_ligne", "aller_ligne" (ligne),
// "valider_ligne", "supprimer_ligne", "abandonner_ligne", "choisir_ligne" (ligne),
// "lire_plus" (ligne: reads an access list on to that row).
//
// The screens ask synchronously, and nobody waits for a person inside an action:
// the gesture carries "reponses", the answers to what the action asks, in the order
// it asks. Each is {"sorte": "question"|"dialogue"|"choix", "valeur": "oui"|"non"|
// code|key|null}, or, for a modal screen the action opens (the analytic breakdown,
// the justification of a bank line), {"sorte": "ecran", "gestes": [...]}: the
// gestures the person made on it so far, shaped as top-level ones without their own
// answers; the questions those gestures ask are answered by the entries after it.
// The first thing asked without an answer stops the action, which is undone whole,
// and the reply's "attente" names it with "rang", the place in "reponses" where
// its answer goes. For a modal screen still open after its gestures (or given none),
// "attente" is {"sorte": "ecran", "rang": R, "etat": S, "refus": null|i}: S the
// screens as the modal screen left them, shaped as a reply's state, and i the
// gesture it refused (the page drops it and those after it). The page asks the
// person and plays the action again with the answer; the action commits once,
// when it runs to its end with every answer given.
//
// A reply: the state ("pile", the open screens; "ecran", the one in front with its
// "code", "focus", "objets", "actions" and "liste"), "accepte", "attente",
// "journal" (what the transcript took), "dessins", and "impressions": the files
// the action printed, landed with it, served by the route above to this session
// only. Errors answer {"erreur": ...}: 400 a malformed request, 403 a request from
// another origin, 404 an unknown session or file, or "session expirée" for a
// session left unused longer than ServeOptions::idleLimit (8 hours by default),
// 413 a body over 64 KiB.
#pragma once

#include <chrono>
#include <memory>
#include <ostream>
#include <string>

namespace app {

struct ServeOptions {
  std::string dossier;
  std::string host = "127.0.0.1";
  int port = 8080;  // 0: a free port
  // Only a loopback address is bound unless this is set: the screens give whoever
  // reaches the port the dossier's books.
  bool allowRemote = false;
  // A session nobody used for this long is closed: its tab is told "session
  // expirée" and starts again.
  std::chrono::milliseconds idleLimit = std::chrono::hours(8);
};

class Serveur {
 public:
  // Loads the modules and checks the options; throws HostError for an address that
  // is not local without allowRemote, or a dossier that cannot be opened.
  explicit Serveur(ServeOptions options);
  ~Serveur();
  Serveur(const Serveur&) = delete;
  Serveur& operator=(const Serveur&) = delete;

  // Binds the port; returns the port bound. Throws HostError when it cannot.
  int lier();
  // Serves until arreter(); lier() first.
  void servir();
  // Stops serving and closes every session. From any thread.
  void arreter();
  // The address a person opens: "http://127.0.0.1:8080/".
  std::string adresse() const;

 private:
  struct Impl;
  std::unique_ptr<Impl> impl_;
};

// `mirvae serve`: binds, prints the address to open, serves until killed.
int servir(const ServeOptions& options, std::ostream& out);

}  // namespace app
