#include "tests/support/library_double.h"

#include <algorithm>
#include <iterator>
#include <stdexcept>

#include "app/script.h"
#include "host/error.h"

namespace testing_support {

namespace {

LibraryDouble* active[2] = {};

// The instance a session builds while double N lives: it wraps an instance of the
// real library and takes every branch the real one has.
template <int N>
class Stand : public host::Automate {
 public:
  explicit Stand(host::Evt* e) : Automate(e), double_(*active[N]) {
    real_.reset(const_cast<host::Automate*>(double_.realFactory()(e)));
    if (!real_) throw host::HostError("mémoire insuffisante pour créer le module « " + double_.name() + " »");
    real_->setCode(double_.name());
    for (const std::string& procedure : real_->branches())
      addBranch(procedure, [this, procedure](host::Evt* call) {
        double_.calls.push_back(procedure);
        auto answer = double_.answers.find(procedure);
        int code;
        if (answer != double_.answers.end()) {
          code = answer->second(*real_, call);
        } else {
          real_->executer(procedure, call);
          code = real_->erreurMethode();
        }
        erreurMethode(code, call);
      });
  }

  void keepState(host::Snapshot& snapshot) override {
    Automate::keepState(snapshot);
    real_->keepState(snapshot);
  }
  void endOfUnit() override {
    if (double_.atEndOfUnit) double_.atEndOfUnit(*real_);
    real_->endOfUnit();
  }

 private:
  LibraryDouble& double_;
  host::AutomatePtr real_;
};

constexpr host::Fabrique kStands[] = {&host::fabriquer<Stand<0>>, &host::fabriquer<Stand<1>>};

}  // namespace

LibraryDouble::LibraryDouble(std::string name) : name_(std::move(name)) {
  app::chargerModules();
  auto free = std::find(std::begin(active), std::end(active), nullptr);
  if (free == std::end(active)) throw std::logic_error("trop de doublures de bibliothèques à la fois");
  slot_ = static_cast<int>(free - std::begin(active));
  real_ = host::Registre::instance().substituer(name_, kStands[slot_]);
  *free = this;
}

LibraryDouble::~LibraryDouble() {
  host::Registre::instance().substituer(name_, real_);
  active[slot_] = nullptr;
}

}  // namespace testing_support
