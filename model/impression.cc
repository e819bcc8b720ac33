#include "model/impression.h"

#include <fcntl.h>
#include <unistd.h>

#include <atomic>
#include <cerrno>
#include <cstdio>
#include <cstring>
#include <filesystem>

#include "host/currency.h"
#include "host/database.h"
#include "host/error.h"
#include "host/session.h"
#include "model/layout.h"

namespace model {

namespace {

// The company as the dossier describes it; keys it does not hold print nothing.
Company companyOf(host::Database& db) {
  auto info = [&db](const char* key) {
    host::Statement& s = db.prepare("SELECT VALEUR FROM DOSSIER_INFO WHERE CLE = ?");
    s.bind(1, std::string(key));
    std::string value = s.step() ? s.text(0) : "";
    s.reset();
    return value;
  };
  std::string postcode = info("company_postcode"), town = info("company_town");
  std::string place = postcode.empty() || town.empty() ? postcode + town : postcode + " " + town;
  return {.name = info("company_name"), .address = {info("company_address"), place}, .siren = info("company_siren")};
}

// The decimals of a currency code; a code the dossier does not know (or none) is
// printed with the keeping currency's.
int decimalsOf(const std::string& code) {
  host::Devises& currencies = host::euro();
  try {
    if (!code.empty()) return currencies.decimales(code);
  } catch (const host::HostError&) {
  }
  return currencies.decimales(host::Devises::kReference);
}

// The first free "<name>-NNN.pdf" of the folder, taken (made empty) at once: two
// sessions printing at the same moment, in one process or two, never get one name.
std::string takeNextFile(const std::string& folder, const std::string& name) {
  for (int n = 1;; ++n) {
    char number[16];
    std::snprintf(number, sizeof number, "%03d", n);
    std::string path = (std::filesystem::path(folder) / (name + "-" + number + ".pdf")).string();
    int fd = ::open(path.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_CLOEXEC, 0644);
    if (fd >= 0) {
      ::close(fd);
      return path;
    }
    if (errno != EEXIST) throw host::HostError("impossible de créer « " + path + " » : " + std::strerror(errno));
  }
}

// "fiche1" for "MIRVAE-IMPR_FICHE1".
std::string printName(const std::string& module) {
  std::size_t at = module.rfind("IMPR_");
  std::string name = at == std::string::npos ? module : module.substr(at + 5);
  for (char& c : name) c = static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
  return name;
}

}  // namespace

Imprimante& Imprimante::courante() {
  thread_local Imprimante printer;
  return printer;
}

void Imprimante::commencer(std::string module, std::string requete) {
  if (folder_ || file_) printed_.clear();
  last_file_.clear();
  Impression document;
  document.module = std::move(module);
  document.requete = std::move(requete);
  printed_.push_back(std::move(document));
}

void Imprimante::entete(Values heading) {
  if (printed_.empty()) throw host::HostError("aucune impression commencée");
  printed_.back().heading = std::move(heading);
}

void Imprimante::ecrire(std::string ligne, Block block) {
  if (printed_.empty()) throw host::HostError("aucune impression commencée");
  printed_.back().lignes.push_back(std::move(ligne));
  printed_.back().blocks.push_back(std::move(block));
}

void Imprimante::terminer() {
  if (printed_.empty()) throw host::HostError("aucune impression commencée");
  if (!folder_ && !file_) return;
  const Impression& document = printed_.back();
  const Layout* layout = layoutFor(document.module);
  if (!layout) throw host::HostError("le module d'impression « " + document.module + " » n'a pas de mise en page");
  host::Session& session = host::Session::courante();
  // Written beside its place now, so that a failure fails the print; put in its place
  // once the user action has committed, so that an action undone or played again
  // leaves no print, or one, behind.
  std::string name = printName(document.module);
  std::filesystem::path folder = file_ ? std::filesystem::path(*file_).parent_path() : std::filesystem::path(*folder_);
  if (!folder.empty()) std::filesystem::create_directories(folder);
  static std::atomic<int> scratches{0};  // sessions of one process print side by side
  std::string scratch =
      (folder / ("." + name + "-" + std::to_string(::getpid()) + "-" + std::to_string(++scratches) + ".part")).string();
  writePdf(*layout, document, companyOf(session.base()), decimalsOf, scratch);
  std::optional<std::string> file = file_, into = folder_;
  session.aLaFinDeLAction([this, &session, scratch, name, file, into](bool committed) {
    if (!committed) {
      std::filesystem::remove(scratch);
      return;
    }
    std::string path = file ? *file : takeNextFile(*into, name);
    std::filesystem::rename(scratch, path);
    last_file_ = path;
    session.transcript().ajouter("impression", name + " : " + path);
  });
}

const Impression& Imprimante::derniere() const {
  if (printed_.empty()) throw host::HostError("aucune impression n'a été faite");
  return printed_.back();
}

void Imprimante::versDossier(std::string folder) {
  folder_ = std::move(folder);
  file_.reset();
}

void Imprimante::versFichier(std::string file) {
  file_ = std::move(file);
  folder_.reset();
}

void Imprimante::nullePart() {
  folder_.reset();
  file_.reset();
}

}  // namespace model
