// The layouts of the twelve prints, "fiche1" ... "fiche6" and "liste1" ... "liste6":
// what each page shows and where, from the values the print jobs fill
// (printing/impr.h) and the fields of the records and lines they print.
#pragma once

namespace printing {

// Registers the twelve layouts under their print jobs' module names.
void registerLayouts();

}  // namespace printing
