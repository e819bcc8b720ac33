#include "entry/parts.h"

namespace entry {

void PrintAfterSaving::saved() {
  if (V_IMPR_FICHE == 1) s_.procedure("IMPR_FICHE");
  V_IMPR_FICHE = 0;
}

VatTotals::VatTotals(EntryScreen& screen) : Part(screen) {}

void VatTotals::provide(Handlers& handlers) { handlers.add("CALCUL_TOTAUX", this, &VatTotals::calcul_totaux); }

bool VatTotals::linesAccepted(Evt* e) {
  if (!(V_TOT_HT == 0)) return true;
  s_.refuser(e, "La saisie d'une pièce dont le total est nul n'est pas autorisée !", "");
  return false;
}

void VatTotals::saving() {
  s_.MIRVAE_HT = V_TOT_HT;
  s_.MIRVAE_TVA = V_TOT_TVA;
  s_.MIRVAE_TTC = V_TOT_TTC;
}

void VatTotals::calcul_totaux(Evt*) {
  Decimal ht, tva, ttc;
  s_.forEachLine([&](Table& line) {
    ht += line.valeur("HT").decimal();
    tva += line.valeur("TVA").decimal();
    ttc += line.valeur("TTC").decimal();
  });
  V_TOT_HT = ht;
  V_TOT_TVA = tva;
  V_TOT_TTC = ttc;
  s_.ecran()->affiche("GRP_TOT", "");
  for (Part* part : s_.parts_) part->linesTotalled(ttc);
}

}  // namespace entry
