// A fresh demo dossier and an open session on it, for tests of every layer.
#pragma once

#include <gtest/gtest.h>

#include <chrono>
#include <filesystem>
#include <memory>
#include <string>
#include <vector>

#include "host/clock.h"
#include "host/registry.h"
#include "host/session.h"
#include "registry/dossier.h"

namespace testing_support {

// Today in the tests: a fixed day, so that every date rule is repeatable.
inline std::chrono::year_month_day jourDeTest() {
  using namespace std::chrono;
  return year_month_day{year(2024), month(3), day(15)};
}

// Registers a module of the tests' own under `name`, unless a module has that name
// already: the registry lives as long as the process, fixtures as long as a test.
template <typename T>
void moduleDeTest(const char* name) {
  if (!host::Registre::instance().module(name)) host::Module("", name, &host::fabriquer<T>, false, "");
}

// What is wrong with the books of a dossier, one text a fault: an operation whose
// piece is missing (unless it never was posted), a piece without its operation, a
// header that is not the sum of its lines, a piece that does not balance, an import
// instance or transfer row left behind. Empty when the books hold.
std::vector<std::string> incoherences(host::Database& db);

// A unique file name in the temporary directory.
std::string cheminTemporaire(const std::string& stem);

// What a shell command printed, standard output and error together, and its exit
// status (-1 when it did not exit).
struct CommandResult {
  int status;
  std::string out;
};
CommandResult runCommand(const std::string& command_line);

// True when each of `wanted` is found in `text` after the one before it.
::testing::AssertionResult inOrder(const std::string& text, const std::vector<std::string>& wanted);

// While it lives, `name` builds `factory`'s automaton; then the name builds what it
// built before. A name not yet registered keeps the stand-in for good, as the
// registry outlives the test.
class ModuleStandIn {
 public:
  ModuleStandIn(const std::string& name, host::Fabrique factory);
  ~ModuleStandIn();
  ModuleStandIn(const ModuleStandIn&) = delete;
  ModuleStandIn& operator=(const ModuleStandIn&) = delete;

 private:
  std::string name_;
  host::Fabrique kept_ = nullptr;
};

class DossierTest : public ::testing::Test {
 protected:
  void SetUp() override;
  void TearDown() override;
  // Reopens the session (a new process on the same dossier).
  void rouvrir();

  host::Session& session() { return *session_; }
  host::Database& base() { return session_->base(); }
  // Runs one SQL query and returns the first column of the first row ("" when none).
  std::string sql(const std::string& query);

  bool demo_ = true;
  std::string path_;
  host::ReponsesPreparees user_;
  std::unique_ptr<host::Session> session_;
};

}  // namespace testing_support
