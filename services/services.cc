#include "services/services.h"

namespace services {

void chargerServices() {}

}  // namespace services
