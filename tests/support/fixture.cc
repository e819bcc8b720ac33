#include "tests/support/fixture.h"

#include <atomic>
#include <unistd.h>

#include "registry/library.h"

namespace testing_support {

std::string cheminTemporaire(const std::string& stem) {
  static std::atomic<int> counter{0};
  return (std::filesystem::temp_directory_path() /
          (stem + "-" + std::to_string(::getpid()) + "-" + std::to_string(counter++) + ".db"))
      .string();
}

void DossierTest::SetUp() {
  registry::chargerBibliotheque();
  host::clock::setToday(jourDeTest());
  host::clock::setTimeOfDay("10:30:00");
  path_ = cheminTemporaire("mirvae-test");
  registry::creerDossier(path_, demo_, jourDeTest());
  session_ = std::make_unique<host::Session>(registry::ouvrirDossier(path_), user_, "testeur");
}

void DossierTest::TearDown() {
  session_.reset();
  host::clock::setToday(std::nullopt);
  host::clock::setTimeOfDay(std::nullopt);
  for (const char* suffix : {"", "-wal", "-shm"}) std::filesystem::remove(path_ + suffix);
}

void DossierTest::rouvrir() {
  session_.reset();
  session_ = std::make_unique<host::Session>(registry::ouvrirDossier(path_), user_, "testeur");
}

std::string DossierTest::sql(const std::string& query) {
  host::Statement& s = base().prepare(query);
  std::string value = s.step() ? s.text(0) : std::string();
  s.reset();
  return value;
}

}  // namespace testing_support
