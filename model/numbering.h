// Identifiers drawn from the dossier's document counters (table NDOC).
//
// Headers, lines and analytic rows get an 8-character identifier from the counter
// named after their table ("MIRVAE", "MIRVAL", "MIRVAANA"). The document model and
// the numbering service share this one function so that a number is never given
// twice, whoever draws it.
#pragma once

#include <string>

#include "host/database.h"

namespace model {

// Increments the counter `table` of NDOC (made at 0 on first use) and returns its
// new value, zero-padded to `width` characters. The caller must be inside a unit
// of work (the user action), so that an undone action gives the number back.
// Throws HostError when the number no longer fits in `width` characters.
std::string prochainIdentifiant(host::Database& db, const std::string& table, int width);

}  // namespace model
