// The library's interface module: procedures that other automata reach by library
// and module name. The access screens print through its "IMPRESSION".
#pragma once

#include "host/table.h"
#include "model/interface.h"

namespace printing {

using namespace host;

class MIRVAEInterface : public model::Interface2 {
 public:
  explicit MIRVAEInterface(Evt* e);

 private:
  Table MIRVAL{this, "", "MIRVAL", ""};
};

}  // namespace printing
