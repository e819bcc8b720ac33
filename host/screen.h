// The state of a screen, not its drawing: what a front end, a test or the demo reads.
#pragma once

#include <map>
#include <set>
#include <string>
#include <utility>
#include <vector>

namespace host {

class Ecran {
 public:
  // Object lists end with "" in the calls of the library: affiche("P1", "").
  template <typename... Names>
  void affiche(Names... names) { (redisplay(names), ...); }
  template <typename... Names>
  void autorise(Names... names) { (setForbidden(names, false), ...); }
  template <typename... Names>
  void interdit(Names... names) { (setForbidden(names, true), ...); }
  template <typename... Names>
  void cacher(Names... names) { (setHidden(names, true), ...); }
  template <typename... Names>
  void montrer(Names... names) { (setHidden(names, false), ...); }

  // Caption of screen command n ("Infos fiche").
  void commande(int n, std::string caption) { commands_[n] = std::move(caption); }
  // Caption of a list column or any object.
  void titre(const std::string& object, std::string caption) { captions_[object] = std::move(caption); }
  void libelle(const std::string& object, std::string caption) { titre(object, std::move(caption)); }
  // Applies list function n to a list (20: show the current line's new values).
  // The state keeps which were applied, in order; the list itself is the model's.
  void fonction(int n, const std::string& list) { functions_.emplace_back(n, list); }
  const std::vector<std::pair<int, std::string>>& fonctions() const { return functions_; }
  // Switches the document on screen to visualisation.
  void toVisu() { visu_requested_ = true; }

  bool estInterdit(const std::string& name) const { return forbidden_.count(name) != 0; }
  bool estCache(const std::string& name) const { return hidden_.count(name) != 0; }
  std::string commandeLibelle(int n) const;
  std::string titreDe(const std::string& object) const;
  const std::vector<std::string>& affichages() const { return redisplayed_; }
  // What the front end has not drawn yet: the objects redisplayed and the list
  // functions applied, in order. Taking it empties both, so that a screen kept open
  // over a long session holds only what came since it was last drawn.
  struct Dessin {
    std::vector<std::string> affichages;
    std::vector<std::pair<int, std::string>> fonctions;
  };
  Dessin prendreDessin() { return {std::exchange(redisplayed_, {}), std::exchange(functions_, {})}; }
  // Whether `name` was redisplayed since the last call for it; the call forgets it,
  // so the model shows a list again once however many times it was asked.
  bool takeRedisplay(const std::string& name) { return pending_.erase(name) != 0; }
  bool visuDemandee() const { return visu_requested_; }
  void oublierVisu() { visu_requested_ = false; }
  const std::string& focus() const { return focus_; }
  void setFocus(std::string name) { focus_ = std::move(name); }

 private:
  void redisplay(const char* name);
  void setForbidden(const char* name, bool forbidden);
  void setHidden(const char* name, bool hidden);

  std::set<std::string> forbidden_, hidden_, pending_;
  std::map<int, std::string> commands_;
  std::map<std::string, std::string> captions_;
  std::vector<std::string> redisplayed_;
  std::vector<std::pair<int, std::string>> functions_;
  std::string focus_;
  bool visu_requested_ = false;
};

}  // namespace host
