#include "app/script.h"

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <sstream>

#include "app/exports.h"
#include "app/script_format.h"
#include "app/script_player.h"
#include "host/clock.h"
#include "host/error.h"
#include "host/session.h"
#include "model/impression.h"
#include "registry/dossier.h"
#include "registry/library.h"
#include "services/services.h"

extern const char* const demo_script;

namespace app {

std::string userName() {
  const char* user = std::getenv("USER");
  return user && *user ? user : "mirvae";
}

std::string dossierImpressions(const std::string& dossier) {
  std::filesystem::path path(dossier);
  return (path.parent_path() / (path.stem().string() + "-impressions")).string();
}

void chargerModules() {
  registry::chargerBibliotheque();
  services::chargerServices();
}

int jouerFichier(const std::string& dossier, const std::string& script, std::ostream& out) {
  std::ifstream in(script);
  if (!in) throw host::HostError("script « " + script + " » illisible");
  return jouer(dossier, in, script, out);
}

int jouer(const std::string& dossier, std::istream& script, const std::string& scriptName, std::ostream& out) {
  chargerModules();
  std::vector<Instruction> lines;
  try {
    lines = parseScript(script);
  } catch (const ScriptError& e) {
    out << e.describe(scriptName) << "\n";
    return 1;
  }
  ScriptPlayer player(std::move(lines), out);
  host::Session session(registry::ouvrirDossier(dossier), player, userName());
  model::DestinationGuard printing;
  model::Imprimante::courante().versDossier(dossierImpressions(dossier));
  try {
    player.play(session);
  } catch (const ScriptError& e) {
    out << e.describe(scriptName) << "\n";
    return 1;
  }
  return 0;
}

int demo(const std::string& path, std::ostream& out) {
  chargerModules();
  // Only a dossier is ever replaced: a mistyped path must not cost a person a file.
  if (std::filesystem::exists(path)) {
    try {
      registry::ouvrirDossier(path);
    } catch (const host::HostError& error) {
      throw host::HostError("« " + path + " » existe et n'est pas remplacé : " + error.what());
    }
    for (const char* suffix : {"", "-wal", "-shm"}) std::filesystem::remove(path + suffix);
  }
  registry::creerDossier(path, true, host::clock::today());
  out << "Dossier de démonstration créé : " << path << "\n\n";

  std::istringstream script(demo_script);
  int result = jouer(path, script, "démo", out);

  out << "\nGrand livre\n\n";
  imprimerGrandLivre(*registry::ouvrirDossier(path), out);
  out << "\nLe dossier de démonstration est " << std::filesystem::absolute(path).string()
      << " (mirvae ledger, mirvae export ou sqlite3 le lisent).\n";
  return result;
}

}  // namespace app
