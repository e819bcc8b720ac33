#include "host/screen.h"

namespace host {

std::string Ecran::commandeLibelle(int n) const {
  auto it = commands_.find(n);
  return it == commands_.end() ? std::string() : it->second;
}

std::string Ecran::titreDe(const std::string& object) const {
  auto it = captions_.find(object);
  return it == captions_.end() ? std::string() : it->second;
}

void Ecran::redisplay(const char* name) {
  if (!name || !*name) return;
  redisplayed_.emplace_back(name);
  pending_.insert(name);
}

void Ecran::setForbidden(const char* name, bool forbidden) {
  if (!name || !*name) return;
  if (forbidden)
    forbidden_.insert(name);
  else
    forbidden_.erase(name);
}

void Ecran::setHidden(const char* name, bool hidden) {
  if (!name || !*name) return;
  if (hidden)
    hidden_.insert(name);
  else
    hidden_.erase(name);
}

}  // namespace host
