// Loading the library: the load-time declarations of every unit, in load order. The
// modules of the accounting application that it calls by name are loaded beside it
// by whoever hosts it (services::chargerServices for the stand-ins).
#pragma once

namespace registry {

// Makes the declarations once per process; later calls do nothing.
void chargerBibliotheque();

}  // namespace registry
