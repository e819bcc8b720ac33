#include "entry/parts.h"
#include "model/child_rows.h"

namespace entry {

namespace {

// A settlement row names its line by the line's IDENT itself.
model::LineKey byLine(Champ& identr) { return {identr, model::LineKey::Ident}; }

}  // namespace

JustificationRows::JustificationRows(EntryScreen& screen) : Part(screen) {}

void JustificationRows::provide(Handlers& handlers) {
  handlers.add("EXTRACTION_TABLE_MIRVAJUS", this, &JustificationRows::extraction_table_mirvajus);
  handlers.add("SUPPRESSION_TABLE_MIRVAJUS", this, &JustificationRows::suppression_table_mirvajus);
  handlers.add("VALIDATION_TABLE_MIRVAJUS", this, &JustificationRows::validation_table_mirvajus);
}

void JustificationRows::lineExtracted() { s_.procedure("EXTRACTION_TABLE_MIRVAJUS"); }

void JustificationRows::lineSaved() { s_.procedure("VALIDATION_TABLE_MIRVAJUS"); }

void JustificationRows::lineDeleted() { s_.procedure("SUPPRESSION_TABLE_MIRVAJUS"); }

void JustificationRows::discardWorkingRows() {
  model::removeChildRows(MIRVAJUS_M01, byLine(MIRVAJUS_M01_IDENTR), s_.MIRVAL_IDENT.chaine());
}

void JustificationRows::amountsConverted(const std::string& line,
                                         const std::function<Decimal(const Decimal&)>& convert) {
  if (line.empty()) return;
  model::convertChildRows(MIRVAJUS_M01, byLine(MIRVAJUS_M01_IDENTR), line, {&MIRVAJUS_M01_MTREGS}, convert);
}

void JustificationRows::extraction_table_mirvajus(Evt*) {
  discardWorkingRows();
  model::copyChildRows(MIRVAJUS, byLine(MIRVAJUS_IDENTR), MIRVAJUS_M01, s_.MIRVAL_IDENT.chaine());
}

void JustificationRows::validation_table_mirvajus(Evt*) {
  model::copyChildRows(MIRVAJUS_M01, byLine(MIRVAJUS_M01_IDENTR), MIRVAJUS, s_.MIRVAL_IDENT.chaine());
}

void JustificationRows::suppression_table_mirvajus(Evt*) {
  model::removeChildRows(MIRVAJUS, byLine(MIRVAJUS_IDENTR), s_.MIRVAL_IDENT.chaine());
}

}  // namespace entry
