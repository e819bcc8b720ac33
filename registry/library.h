// Loading the library: the load-time declarations of every unit, in load order,
// and the stand-ins of the accounting application's modules.
#pragma once

namespace registry {

// Makes the declarations once per process; later calls do nothing.
void chargerBibliotheque();

}  // namespace registry
