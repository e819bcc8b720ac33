#include "services/zefndoc.h"

#include <gtest/gtest.h>
#include <sys/wait.h>
#include <unistd.h>

#include <set>

#include "host/error.h"
#include "registry/dossier.h"
#include "tests/services/appelant.h"

namespace {

using namespace host;
using testing_support::Appelant;
using testing_support::ServicesTest;

using ZefndocTest = ServicesTest;

// Draws one identifier as the entry screen does, within the unit of the action.
std::string attribuer(Appelant& appelant, const char* table) {
  Entier width(8);
  Chaine ident;
  EvtParamRef evt(6, "CP", "NDOC", table, "", &width, &ident);
  appelant.appelerProcedure("*", "ZEFNDOC", "INTERFACE", "ATTRIBUE_NUMERO", &evt, -1);
  appelant.appelerProcedure("*", "ZEFNDOC", "INTERFACE", "VALIDE_NUMERO", &evt, -1);
  return ident.chaine();
}

// Numbers follow each other per table on eight digits and an undone action gives its
// number back: the document cycle's saves show both.

TEST_F(ZefndocTest, ConfirmingANumberNeverDrawnIsRefused) {
  Entier width(8);
  Chaine ident;
  ident = "00000005";
  EvtParamRef evt(6, "CP", "NDOC", "MIRVAL", "", &width, &ident);
  EXPECT_NE(echec("*", "ZEFNDOC", "INTERFACE", "VALIDE_NUMERO", evt).find("00000005"), std::string::npos);
  EvtParamRef other(6, "CP", "NUMPI", "MIRVAL", "", &width, &ident);
  EXPECT_NE(echec("*", "ZEFNDOC", "INTERFACE", "ATTRIBUE_NUMERO", other).find("NUMPI"), std::string::npos);
}

// Two processes drawing from one dossier at the same time never get the same number.
TEST_F(ZefndocTest, TwoProcessesNeverReceiveTheSameIdentifier) {
  constexpr int kProcesses = 2, kEach = 60;
  appelant_.reset();
  session_.reset();  // a child must not inherit an open connection
  int pipes[kProcesses][2];
  pid_t children[kProcesses];
  for (int p = 0; p < kProcesses; ++p) {
    ASSERT_EQ(pipe(pipes[p]), 0);
    children[p] = fork();
    ASSERT_GE(children[p], 0);
    if (children[p] == 0) {
      close(pipes[p][0]);
      int code = 0;
      try {
        ReponsesPreparees user;
        Session child(registry::ouvrirDossier(path_), user, "processus" + std::to_string(p));
        Appelant appelant(nullptr);
        for (int i = 0; i < kEach && code == 0; ++i) {
          std::string ident;
          if (!child.action([&] { ident = attribuer(appelant, "MIRVAL"); })) code = 2;
          ident += "\n";
          if (write(pipes[p][1], ident.data(), ident.size()) != static_cast<ssize_t>(ident.size())) code = 3;
        }
      } catch (...) {
        code = 4;
      }
      close(pipes[p][1]);
      _exit(code);
    }
    close(pipes[p][1]);
  }
  std::multiset<std::string> all;
  for (int p = 0; p < kProcesses; ++p) {
    std::string out;
    char buffer[512];
    for (ssize_t n; (n = read(pipes[p][0], buffer, sizeof buffer)) > 0;) out.append(buffer, static_cast<size_t>(n));
    close(pipes[p][0]);
    int status = 0;
    waitpid(children[p], &status, 0);
    EXPECT_TRUE(WIFEXITED(status) && WEXITSTATUS(status) == 0) << "processus " << p << " : " << status;
    for (std::size_t at = 0, end; (end = out.find('\n', at)) != std::string::npos; at = end + 1)
      all.insert(out.substr(at, end - at));
  }
  rouvrir();
  EXPECT_EQ(all.size(), static_cast<std::size_t>(kProcesses * kEach));
  EXPECT_EQ(std::set<std::string>(all.begin(), all.end()).size(), all.size()) << "un numéro donné deux fois";
  EXPECT_EQ(sql("SELECT DERNIER FROM NDOC WHERE NOM = 'MIRVAL'"), std::to_string(kProcesses * kEach));
}

}  // namespace
