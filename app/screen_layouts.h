// The layouts of the screens as the browser page draws them: for a screen code
// ("MIRVAE-ACCES1", "MIRVAE-GESTION4", "MIRVAE-GEST_ANA"), its groups of fields with
// captions and formats, its list and columns, its buttons. Kept as data
// (app/screens/dispositions.json, built into the program).
#pragma once

#include <optional>
#include <string>

namespace app {

// The layout of screen `code` as JSON text, or nothing when no layout names it.
std::optional<std::string> dispositionEcran(const std::string& code);

}  // namespace app
