// How a screen shows its values to the user.
//
// An amount is shown with the decimals of its currency (JPY "1500", EUR "1500.00"):
// the currency of the record on screen (its main table's MONNAIE_IDENT, an access
// list's row as the list is filled) when it has one, else the currency of the
// document in front (the currency service's current currency). Every other value
// reads as it is (dates DD/MM/YYYY).
#pragma once

#include <map>
#include <string>

#include "host/automate.h"
#include "host/value.h"

namespace model {

// The currency in which `screen` shows and takes its amounts now.
std::string screenCurrency(host::Automate& screen);

// The decimals of each currency, looked up once for a list of values.
class AmountDecimals {
 public:
  int of(const std::string& currency);

 private:
  std::map<std::string, int> known_;
};

// `value` as `screen` shows it; the currency is looked up only for an amount.
std::string shownText(const host::Valeur& value, host::Automate& screen, AmountDecimals& decimals);

}  // namespace model
