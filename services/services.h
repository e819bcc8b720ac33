// The stand-ins of the accounting application's modules that the library calls by
// name, registered under their own names.
#pragma once

namespace services {

void chargerServices();

}  // namespace services
