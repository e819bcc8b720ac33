// A procedure library of the accounting application ("CPPIECE-INTERFACE",
// "COMPTA-MOD_CAL_BIBLIOPROC") watched, or partly played, by a test.
#pragma once

#include <functional>
#include <map>
#include <string>
#include <vector>

#include "host/automate.h"
#include "host/registry.h"

namespace testing_support {

// While it lives, sessions build this double under the library's registry name: it
// records each procedure called, in order, and hands the call on to the real
// library unless the test answers it itself. A session keeps the library instance
// it built first, so make the double before the session (a fixture member does).
// At most two live at once.
class LibraryDouble {
 public:
  explicit LibraryDouble(std::string name);
  // Registers the real library again.
  ~LibraryDouble();
  LibraryDouble(const LibraryDouble&) = delete;
  LibraryDouble& operator=(const LibraryDouble&) = delete;

  // Answers a call in place of the real library and returns the method result the
  // caller reads; `real` is the session's instance of the real library.
  using Answer = std::function<int(host::Automate& real, host::Evt* e)>;

  std::vector<std::string> calls;
  std::map<std::string, Answer, std::less<>> answers;
  // Runs when a user action's unit ends, before the real library ends its own work.
  std::function<void(host::Automate& real)> atEndOfUnit;

  const std::string& name() const { return name_; }
  host::Fabrique realFactory() const { return real_; }

 private:
  std::string name_;
  int slot_ = 0;
  host::Fabrique real_ = nullptr;
};

}  // namespace testing_support
