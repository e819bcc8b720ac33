#include "printing/interface.h"

namespace printing {

MIRVAEInterface::MIRVAEInterface(Evt* e) : Interface2(e) {
  nomBase("CP");
  nomTable("MIRVAE", nullptr);
  directoryAlias_ = "[ZEFDEV]\\COMPTA";
}

}  // namespace printing
