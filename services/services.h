// The stand-ins of the accounting application's modules that the library calls by
// name, registered under their own names.
#pragma once

namespace services {

// Registers them once per process; later calls do nothing.
void chargerServices();

}  // namespace services
