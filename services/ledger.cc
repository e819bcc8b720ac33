#include "services/ledger.h"

#include "host/automate.h"

namespace services {

void ajouterProceduresPieces(host::Automate&) {}

}  // namespace services
