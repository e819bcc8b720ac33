#include "model/shown.h"

#include "host/currency.h"
#include "host/table.h"

namespace model {

std::string screenCurrency(host::Automate& screen) {
  if (host::Table* main = screen.table(false); main && !main->nom().empty())
    for (const host::Colonne& c : main->colonnes())
      if (c.name == "MONNAIE_IDENT") {
        std::string ident = main->valeur(c.name).chaine();
        if (!ident.empty()) return ident;
      }
  return host::euro().courante();
}

int AmountDecimals::of(const std::string& currency) {
  auto it = known_.find(currency);
  if (it == known_.end()) it = known_.emplace(currency, host::euro().decimales(currency)).first;
  return it->second;
}

std::string shownText(const host::Valeur& value, host::Automate& screen, AmountDecimals& decimals) {
  if (value.genre() != host::Genre::Monnaie) return value.chaine();
  return host::amountText(value.decimal(), decimals.of(screenCurrency(screen)));
}

}  // namespace model
