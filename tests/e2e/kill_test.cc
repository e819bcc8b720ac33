// The program killed between any two of its writes, as kill -9 would, while it
// creates, changes and deletes a client invoice: every time, the dossier opens again
// with its books whole.
#include <gtest/gtest.h>
#include <sys/wait.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>

#include "host/database.h"
#include "registry/dossier.h"
#include "tests/support/fixture.h"

namespace {

constexpr const char* kRoad = R"(today 15/03/2024 10:30
open MIRVAE-ACCES1
press CREER
type VLIBCP1 "Brasserie Lissandre"
line new
type LST_MIRVAL.NUMCP 708500
type LST_V_HT 100
line validate
line new
type LST_MIRVAL.NUMCP 758000
type LST_V_HT 50
line validate
answer dialog 1
press B_VALID_DOC
close
select 1
press MODIFIER
line 1
type LST_V_HT 120
line validate
press B_VALID_DOC
close
select 1
press MODIFIER
press SUPPRESSION
expect sql "SELECT count(*) FROM MIRVAE" = 0
expect sql "SELECT count(*) FROM PIECE" = 0
)";

int statusOf(const std::string& command) {
  int status = std::system(command.c_str());
  return WIFEXITED(status) ? WEXITSTATUS(status) : -1;
}

TEST(KillTest, KilledBetweenAnyTwoWritesTheBooksStayWhole) {
  std::string model = testing_support::cheminTemporaire("mirvae-kill-model");
  std::string dossier = testing_support::cheminTemporaire("mirvae-kill");
  std::string script = testing_support::cheminTemporaire("mirvae-kill-road") + ".txt";
  std::ofstream(script) << kRoad;
  std::string binary = std::string("'") + MIRVAE_BINARY + "'";
  registry::creerDossier(model, true, testing_support::jourDeTest());

  int kills = 0;
  for (int at = 1;; ++at) {
    for (const char* suffix : {"", "-wal", "-shm"}) std::filesystem::remove(dossier + suffix);
    std::filesystem::copy_file(model, dossier);
    int status = statusOf("MIRVAE_FAULT_KILL_AT_WRITE=" + std::to_string(at) + " " + binary + " run '" + dossier +
                          "' '" + script + "' > /dev/null 2>&1");
    if (status == 0) break;  // the road ended before its at-th write
    ASSERT_EQ(status, 137) << "write " << at;
    ++kills;
    auto db = host::Database::ouvrir(dossier);
    EXPECT_EQ(testing_support::incoherences(*db), std::vector<std::string>{}) << "killed before write " << at;
    ASSERT_LT(at, 5000) << "the road never ends";
  }
  EXPECT_GT(kills, 50);
  for (const auto& path : {model, dossier})
    for (const char* suffix : {"", "-wal", "-shm"}) std::filesystem::remove(path + suffix);
  std::filesystem::remove(script);
}

}  // namespace
