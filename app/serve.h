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
//   POST   /api/sessions              opens a session; answers its id and state
//   GET    /api/sessions/ID           the state of the screens
//   POST   /api/sessions/ID/gestes    one user action: {"geste": ..., ...}
//   DELETE /api/sessions/ID           closes the session
// A gesture is "ouvrir" (module), "fermer", "saisir" (objet, texte), "appuyer"
// (objet), "choix" (objet), "nouvelle_ligne", "aller_ligne" (ligne),
// "valider_ligne", "supprimer_ligne", "abandonner_ligne", "choisir_ligne" (ligne),
// "lire_plus" (ligne: reads an access list on to that row). It may carry
// "reponses": the answers to the questions the action asks, in order, each
// {"sorte": "question"|"dialogue"|"choix", "valeur": "oui"|"non"|code|key|null}.
// The screens ask synchronously: a question with no answer given stops the action,
// which is undone whole, and the reply names the question ("attente"); the page
// asks the person and plays the action again with the answer.
#pragma once

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
