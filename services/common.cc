#include "services/common.h"

#include <algorithm>

#include "host/database.h"
#include "host/error.h"
#include "host/event.h"
#include "host/session.h"
#include "host/table.h"

namespace services {

using namespace host;

std::optional<std::string> fenetreDeChoix(Session& session, const std::string& window,
                                          const std::vector<std::string>& rows) {
  std::optional<std::string> pick = session.choisir(window, rows);
  if (pick && std::find(rows.begin(), rows.end(), *pick) == rows.end())
    throw HostError("« " + *pick + " » ne figure pas dans la fenêtre de choix « " + window + " »");
  return pick;
}

std::vector<std::string> colonne(Database& db, const std::string& sql, const std::vector<std::string>& values) {
  Statement& s = db.prepare(sql);
  for (std::size_t i = 0; i < values.size(); ++i) s.bind(static_cast<int>(i) + 1, std::string_view(values[i]));
  std::vector<std::string> out;
  try {
    while (s.step()) out.push_back(s.text(0));
  } catch (...) {
    s.reset();
    throw;
  }
  s.reset();
  return out;
}

void dansUnite(Database& db, const std::function<void()>& work) {
  if (db.profondeur() > 0) {
    work();
    return;
  }
  db.begin();
  try {
    work();
  } catch (...) {
    db.rollback();
    throw;
  }
  db.commit();
}

bool essayerUnite(Database& db) {
  if (db.profondeur() > 0) throw HostError("une unité de travail est déjà en cours");
  Statement& read = db.prepare("PRAGMA busy_timeout");
  read.step();
  long long wait = read.integer(0);
  read.reset();
  db.exec("PRAGMA busy_timeout = 0");
  bool begun = true;
  try {
    db.begin();
  } catch (const HostError&) {
    begun = false;
  }
  db.exec("PRAGMA busy_timeout = " + std::to_string(wait));
  return begun;
}

bool remplirInterface(const char* interfaceTable, const char* source, const char* key, const Valeur& value) {
  Table target(nullptr, "", interfaceTable, "");
  Table from(nullptr, "", source, "");
  Champ field(key, &from);
  target.initRequete();
  target.vide();
  target.raz();
  bool found = from.lit(3, field, '=', value) == 0;
  if (found) target.copier(from);
  target.ecrit();
  return found;
}

void exigerParametres(Evt* e, int count) {
  if (e->nbParams() < count)
    throw HostError("« " + e->nom() + " » attend " + std::to_string(count) + " paramètre(s), " +
                    std::to_string(e->nbParams()) + " reçu(s)");
}

}  // namespace services
