#include "model/mains.h"

#include <functional>
#include <optional>

#include "host/automate.h"
#include "host/currency.h"
#include "host/error.h"
#include "host/registry.h"
#include "host/table.h"
#include "host/text.h"
#include "model/acces.h"
#include "model/sdocum.h"
#include "model/shown.h"
#include "model/step.h"
#include "model/traitecr.h"

namespace model {

namespace {

using host::Automate;
using host::HostError;
using host::Session;

// A screen object as the hands reach it: a variable, or a field of a binding.
struct Target {
  host::Donnee* variable = nullptr;
  host::Table* table = nullptr;
  std::string column;
  bool listColumn = false;
  std::string branch;  // the branch run when the object is left ("" when none)

  host::Genre genre() const {
    if (variable) return variable->genre();
    for (const host::Colonne& c : table->colonnes())
      if (c.name == column) return c.genre;
    return host::Genre::Texte;
  }
  host::Valeur read() const { return variable ? variable->valeur() : table->valeur(column); }
  void write(const host::Valeur& v) const {
    if (variable)
      variable->affecter(v);
    else
      table->affecter(column, v);
  }
};

// The value a user typed into `target`, as the screen takes it: a text that may reach
// the books only as clean UTF-8, an amount with the decimals of its currency, anything
// else read as the object's kind. Throws HostError for a text the object cannot take.
host::Valeur typedValue(Automate& screen, const Target& target, const std::string& text,
                        const std::string& object) {
  host::text::requireValid(text, object);
  if (target.genre() != host::Genre::Monnaie) return host::Valeur::depuisTexte(target.genre(), text, object);
  return host::Valeur::montant(host::euro().saisi(text, screenCurrency(screen), object));
}

// The prefix of the list columns of the screen ("LST_"), "" when it has no list.
std::string listPrefix(Automate& screen) {
  std::string name;
  if (auto* document = dynamic_cast<Sdocum*>(&screen)) name = document->listName();
  if (auto* list = dynamic_cast<FreeList*>(&screen)) name = list->listName();
  return name.empty() ? "" : name + "_";
}

// Every name under which the screen may forbid or hide `object`: a field with and
// without its table ("MIRVAE.NUMJL", and "NUMJL" for the main table), each with and
// without the list's prefix ("LST_MIRVAL.COTVA", "MIRVAL.COTVA"; "LST_V_HT", "V_HT").
std::vector<std::string> namesOf(Automate& screen, const std::string& object) {
  std::string name = object;
  std::string list = listPrefix(screen);
  if (!list.empty() && name.rfind(list, 0) == 0) name = name.substr(list.size());
  std::vector<std::string> bare{name};
  if (std::size_t dot = name.find('.'); dot != std::string::npos) {
    host::Table* main = screen.table(false);
    if (main && name.substr(0, dot) == main->alias()) bare.push_back(name.substr(dot + 1));
  } else if (host::Table* main = screen.table(false); main && !main->nom().empty() && !screen.variable(name)) {
    bare.push_back(main->alias() + "." + name);
  }
  std::vector<std::string> names;
  for (const std::string& b : bare) {
    names.push_back(b);
    if (!list.empty()) names.push_back(list + b);
  }
  return names;
}

// Whether the screen forbade or hid `object` under any of its names.
bool outOfReach(Automate& screen, const std::string& object) {
  for (const std::string& name : namesOf(screen, object))
    if (screen.ecran()->estInterdit(name) || screen.ecran()->estCache(name)) return true;
  return false;
}

Target resolve(Automate& screen, const std::string& object) {
  Target t;
  std::string name = object;
  if (std::string list = listPrefix(screen); !list.empty() && object.rfind(list, 0) == 0) {
    t.listColumn = true;
    name = object.substr(list.size());
  }
  if (std::size_t dot = name.find('.'); dot != std::string::npos) {
    std::string alias = name.substr(0, dot);
    t.column = name.substr(dot + 1);
    t.table = alias == screen.table(false)->alias() ? screen.table(false) : screen.tableNommee(alias);
    if (!t.table) throw HostError("table « " + alias + " » inconnue de l'écran « " + screen.code() + " »");
    bool known = false;
    for (const host::Colonne& c : t.table->colonnes()) known = known || c.name == t.column;
    if (!known) throw HostError("champ « " + name + " » inconnu de l'écran « " + screen.code() + " »");
    // A field of the main table is handled under its bare name ("DTOPE").
    if (!t.listColumn && !screen.aBranche(object) && t.table == screen.table(false)) name = t.column;
  } else {
    t.variable = screen.variable(name);
    if (!t.variable) throw HostError("objet « " + object + " » inconnu de l'écran « " + screen.code() + " »");
  }
  std::string branch = t.listColumn || screen.aBranche(object) ? object : name;
  if (screen.aBranche(branch)) t.branch = branch;
  return t;
}

// The screen catches up with what the action did: an access list is refilled, a
// document asked to switch to visualisation does, a document's list redisplayed
// shows its lines again.
void catchUp(Automate& screen) {
  if (screen.estTermine()) return;
  if (auto* list = dynamic_cast<Scritere*>(&screen)) list->refreshList();
  if (auto* document = dynamic_cast<Saisie*>(&screen)) document->applyVisuRequest();
  if (auto* document = dynamic_cast<Sdocum*>(&screen); document && !document->estTermine()) document->catchUpList();
}

// One user action on the screen in front: `body` returns whether it was accepted.
// The queued procedures run inside the action, then the screen catches up.
// A refusal names the action, and the control that has the focus when it is not
// `object`.
bool act(Session& session, const std::string& kind, const std::string& text, const std::string& object,
         const std::function<bool(Automate&)>& body) {
  Automate& screen = ecranDevant(session);
  session.transcript().ajouter(kind, text);
  bool accepted = false;
  std::string focus;
  bool ok = session.action([&] {
    if (auto* document = dynamic_cast<Sdocum*>(&screen)) document->forgetRefusedControl();
    accepted = body(screen);
    session.executerFile();
    catchUp(screen);
    focus = screen.ecran()->focus();
  });
  if (ok && !accepted)
    session.transcript().ajouter("refus", focus.empty() || focus == object ? text : text + " (" + focus + ")");
  // The front end draws what the action changed; the screens keep nothing of it.
  for (Automate* open : session.ecrans()) session.agent().dessiner(*open, open->ecran()->prendreDessin());
  return ok && accepted;
}

Sdocum& documentInFront(Session& session) {
  auto* document = dynamic_cast<Sdocum*>(&ecranDevant(session));
  if (!document) throw HostError("l'écran « " + ecranDevant(session).code() + " » n'a pas de liste de lignes");
  return *document;
}

bool lineAction(Session& session, const std::string& text, bool (Sdocum::*move)()) {
  documentInFront(session);
  return act(session, "action", text, text, [move](Automate& a) { return (static_cast<Sdocum&>(a).*move)(); });
}

}  // namespace

Automate& ecranDevant(Session& session) {
  Automate* front = session.ecranCourant();
  if (!front) throw HostError("aucun écran n'est ouvert");
  return *front;
}

bool ouvrir(Session& session, const std::string& name) {
  if (!host::Registre::instance().module(name)) throw HostError("module « " + name + " » inconnu");
  const std::size_t before = session.ecrans().size();
  bool ok = session.action([&] {
    session.ouvrir(host::Registre::instance().creer(name, nullptr));
    session.executerFile();
    if (Automate* front = session.ecranCourant()) catchUp(*front);
  });
  // A screen that left during its start is closed already.
  return ok && session.ecrans().size() > before;
}

void fermer(Session& session) {
  act(session, "action", "fermer", "", [](Automate& a) {
    a.sortir(nullptr, 0);
    return true;
  });
}

bool saisir(Session& session, const std::string& object, const std::string& text) {
  Automate& screen = ecranDevant(session);
  Target target = resolve(screen, object);
  // The value is taken as the screen will show it, and recorded so.
  std::optional<host::Valeur> typed;
  std::string refusal;
  try {
    typed = typedValue(screen, target, text, object);
  } catch (const HostError& error) {
    refusal = error.what();
  }
  AmountDecimals decimals;
  std::string shown = typed && typed->genre() == host::Genre::Monnaie ? shownText(*typed, screen, decimals) : text;
  return act(session, "saisie", object + " = " + shown, object, [&](Automate& a) {
    auto* document = dynamic_cast<Sdocum*>(&a);
    auto* saisie = dynamic_cast<Saisie*>(&a);
    // Nothing of the screen runs for an object it put out of reach.
    if (outOfReach(a, object)) return false;
    if (saisie && saisie->modeCourant() != "C" && saisie->modeCourant() != "M") return false;
    if (target.listColumn) {
      if (document ? !document->beginLineChange() : !dynamic_cast<FreeList*>(&a)) return false;
    } else if (document) {
      document->leaveList();
    }
    host::Chaine control(object);
    host::EvtParamRef about(1, &control);
    if (step(a, "CTRL_DEBUT_MODIF", &about) != Outcome::accepted) return false;
    if (!target.branch.empty() && step(a, target.branch + "_ENTREE") != Outcome::accepted) return false;
    if (!typed) {
      a.BoiteMessage(refusal, 0, nullptr);
      a.controler(object.c_str(), "");
      return false;
    }
    host::Valeur before = target.read();
    target.write(*typed);
    if (target.branch.empty()) return true;
    if (step(a, target.branch) != Outcome::refused) return true;
    target.write(before);
    if (a.ecran()->focus().empty()) a.controler(object.c_str(), "");
    return false;
  });
}

bool appuyer(Session& session, const std::string& action) {
  Automate& screen = ecranDevant(session);
  if (!screen.aBranche(action)) throw HostError("action « " + action + " » inconnue de l'écran « " + screen.code() + " »");
  return act(session, "action", action, action, [&](Automate& a) {
    // A button the screen disabled or hid cannot be pressed.
    if (outOfReach(a, action)) return false;
    return step(a, action) != Outcome::refused;
  });
}

bool ouvrirChoix(Session& session, const std::string& object) {
  Target target = resolve(ecranDevant(session), object);
  const char* event = target.listColumn ? "CTRL_OUVRE" : "CTRL_CHOISIR";
  return act(session, "action", "choix " + object, object, [&](Automate& a) {
    // A control out of reach opens no choice window.
    if (outOfReach(a, object)) return false;
    host::Chaine control(object);
    host::EvtParamRef about(1, &control);
    return step(a, event, &about) != Outcome::refused;
  });
}

bool nouvelleLigne(Session& session) { return lineAction(session, "nouvelle ligne", &Sdocum::newLine); }
bool validerLigne(Session& session) { return lineAction(session, "valider la ligne", &Sdocum::validateLine); }
bool supprimerLigne(Session& session) { return lineAction(session, "supprimer la ligne", &Sdocum::deleteLine); }
bool abandonnerLigne(Session& session) { return lineAction(session, "abandonner la ligne", &Sdocum::abandonLine); }

bool allerLigne(Session& session, int n) {
  if (auto* list = dynamic_cast<FreeList*>(&ecranDevant(session))) {
    if (n < 1 || n > static_cast<int>(list->rows().size()))
      throw HostError("la liste « " + list->listName() + " » n'a pas de ligne " + std::to_string(n));
    return act(session, "action", "ligne " + std::to_string(n), "",
               [list, n](Automate&) { return list->goToRow(n); });
  }
  Sdocum& document = documentInFront(session);
  if (n < 1 || n > static_cast<int>(document.rows().size()))
    throw HostError("la liste « " + document.listName() + " » n'a pas de ligne " + std::to_string(n));
  return act(session, "action", "ligne " + std::to_string(n), "",
             [n](Automate& a) { return static_cast<Sdocum&>(a).goToLine(n); });
}

// Reads an access list on to its end, as a user scrolling down to its last row.
Scritere& readToTheEnd(Session& session, Scritere& list) {
  if (!list.complete()) session.action([&] { list.readAll(); });
  return list;
}

std::vector<RowText> lignes(Session& session) {
  Automate& screen = ecranDevant(session);
  if (auto* list = dynamic_cast<Scritere*>(&screen)) return readToTheEnd(session, *list).rows();
  if (auto* document = dynamic_cast<Sdocum*>(&screen)) return document->rows();
  if (auto* list = dynamic_cast<FreeList*>(&screen)) return list->rows();
  throw HostError("l'écran « " + screen.code() + " » n'a pas de liste");
}

std::size_t nombreLignes(Session& session) {
  Automate& screen = ecranDevant(session);
  if (auto* list = dynamic_cast<Scritere*>(&screen)) return readToTheEnd(session, *list).rowCount();
  return lignes(session).size();
}

bool choisirLigne(Session& session, int n) {
  auto* list = dynamic_cast<Scritere*>(&ecranDevant(session));
  if (!list) throw HostError("l'écran « " + ecranDevant(session).code() + " » n'a pas de liste d'accès");
  // The user scrolls down to the row first.
  if (n > static_cast<int>(list->rowCount()) && !list->complete())
    session.action([&] { list->readUntil(static_cast<std::size_t>(n)); });
  if (n < 1 || n > static_cast<int>(list->rowCount()))
    throw HostError("la liste n'a pas de ligne " + std::to_string(n));
  return act(session, "action", "choisir la ligne " + std::to_string(n), "", [n](Automate& a) {
    static_cast<Scritere&>(a).selectRow(n);
    return true;
  });
}

bool estInterdit(Session& session, const std::string& object) {
  Automate& screen = ecranDevant(session);
  for (const std::string& name : namesOf(screen, object))
    if (screen.ecran()->estInterdit(name)) return true;
  return false;
}

bool estCache(Session& session, const std::string& object) {
  Automate& screen = ecranDevant(session);
  for (const std::string& name : namesOf(screen, object))
    if (screen.ecran()->estCache(name)) return true;
  return false;
}

std::string valeur(Session& session, const std::string& object) {
  Automate& screen = ecranDevant(session);
  AmountDecimals decimals;
  return shownText(resolve(screen, object).read(), screen, decimals);
}

}  // namespace model
