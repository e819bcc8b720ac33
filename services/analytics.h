// "CPPOANA", "CPCRITA", "CPSECAN" / "INTERFACE": the analytic posts (POANA), the
// distribution keys (CRITA) and the analytic sections (SECAN) seen from the library.
//
//   "LECTURE" (code)   reads the record into the interface table (I_CPPOANA,
//       I_CPCRITA, I_CPSECAN); an unknown code leaves a blank record there and sets
//       the method result to 1.
//   "CHOIX" (code in/out)   the choice window of the records, by code. The pick is
//       written into the parameter and read as "LECTURE" does; a cancelled window
//       leaves the parameter as it was, reads that, and sets the method result to 1.
#pragma once

#include "host/automate.h"

namespace services {

class AnalyticCodes : public host::Automate {
 public:
  void lecture(host::Evt* e);
  void choix(host::Evt* e);

 protected:
  AnalyticCodes(host::Evt* e, const char* interfaceTable, const char* source, const char* key, const char* window);

 private:
  bool read(const std::string& code);
  const char *interface_, *source_, *key_, *window_;
};

struct Cppoana : AnalyticCodes {
  explicit Cppoana(host::Evt* e) : AnalyticCodes(e, "I_CPPOANA", "POANA", "IDENT", "Postes analytiques") {}
};
struct Cpcrita : AnalyticCodes {
  explicit Cpcrita(host::Evt* e) : AnalyticCodes(e, "I_CPCRITA", "CRITA", "IDENT", "Clés de répartition") {}
};
struct Cpsecan : AnalyticCodes {
  explicit Cpsecan(host::Evt* e) : AnalyticCodes(e, "I_CPSECAN", "SECAN", "CSECT", "Sections analytiques") {}
};

}  // namespace services
