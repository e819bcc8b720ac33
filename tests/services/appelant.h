// Tests of the services: a library screen in miniature calls them by name, exactly as
// the library does, on a fresh demo dossier.
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "host/automate.h"
#include "model/traitmnt.h"
#include "tests/support/fixture.h"

namespace testing_support {

struct Appelant : model::Traitmnt {
  explicit Appelant(host::Evt* e) : Traitmnt(e) {}
};

class ServicesTest : public DossierTest {
 protected:
  void SetUp() override {
    DossierTest::SetUp();
    appelant_ = std::make_unique<Appelant>(nullptr);
  }
  void TearDown() override {
    appelant_.reset();
    DossierTest::TearDown();
  }

  // Calls a procedure of another library as one user action and returns the caller's
  // method result afterwards. The action must succeed.
  int appeler(const char* base, const char* library, const char* procedure, host::Evt& e,
              const char* module = "INTERFACE") {
    int result = -1;
    bool ok = session().action([&] {
      appelant_->appelerProcedure(base, library, module, procedure, &e, -1);
      result = appelant_->erreurMethode();
    });
    EXPECT_TRUE(ok) << session().transcript().rendu();
    return result;
  }
  int compta(const char* procedure, host::Evt& e) {
    return appeler("COMPTA", "COMPTA", procedure, e, "MOD_CAL_BIBLIOPROC");
  }
  // Runs a module to its end as one user action; false when the action failed.
  bool lancer(const char* base, const char* library, const char* module, host::Evt& e) {
    return session().action([&] { appelant_->appelerModule(base, library, module, &e); });
  }
  // The same call, expected to fail: returns the error the user was told.
  std::string echec(const char* base, const char* library, const char* module, const char* procedure,
                    host::Evt& e) {
    bool ok = session().action([&] { appelant_->appelerProcedure(base, library, module, procedure, &e, -1); });
    EXPECT_FALSE(ok);
    auto errors = vus("erreur");
    return errors.empty() ? std::string() : errors.back();
  }
  std::vector<std::string> vus(const std::string& kind) { return session().transcript().textes(kind); }

  std::unique_ptr<Appelant> appelant_;
};

}  // namespace testing_support
