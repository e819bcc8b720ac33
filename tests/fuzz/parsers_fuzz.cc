// Arbitrary bytes for the readers of what people write: a session script, and a
// value typed into an amount, a number or a date. Each reader answers with a value
// or a refusal, never a fault the sanitizers see; what it accepts reads back the
// same from the text it gives for it.
//
// Built with clang's libFuzzer (cmake -DMIRVAE_FUZZ=ON); `./project.sh fuzz` runs it.
#include <cstdint>
#include <cstdlib>
#include <sstream>
#include <string>
#include <string_view>

#include "app/script_format.h"
#include "host/decimal.h"
#include "host/error.h"
#include "host/text.h"
#include "host/value.h"

namespace {

void require(bool holds) {
  if (!holds) std::abort();
}

void script(std::string_view input) {
  std::istringstream in{std::string(input)};
  std::vector<app::Instruction> lines;
  try {
    lines = app::parseScript(in);
  } catch (const app::ScriptError&) {
    return;
  }
  // The text a failure quotes back is the line as written: it reads as the same line.
  for (const app::Instruction& line : lines) {
    app::Instruction again;
    require(app::parseLine(line.line, line.text, again));
    require(again.op == line.op && again.args == line.args && again.text == line.text);
  }
}

void amount(std::string_view input) {
  auto value = host::Decimal::parse(input);
  if (!value) return;
  require(host::Decimal::parse(value->toString(0)) == value);
  require(host::Decimal::parse(value->toFixed(2)) == value->rounded(2));
}

void day(std::string_view input) {
  auto read = host::lireJour(input);
  if (!read || !*read) return;
  require(host::lireJour(host::jourIso(*read)) == read);
  require(host::lireJour(host::jourTexte(*read)) == read);
}

// A value typed into a variable of each kind.
void typed(std::string_view input) {
  for (host::Genre genre :
       {host::Genre::Monnaie, host::Genre::Entier, host::Genre::Double, host::Genre::Simple, host::Genre::Date}) {
    host::Valeur value;
    try {
      value = host::Valeur::depuisTexte(genre, input, "essai");
    } catch (const host::HostError&) {
      continue;
    }
    host::Valeur stored = host::Valeur::depuisTexte(genre, value.stockage(), "essai");
    require(host::comparer(stored, value) == 0);
    require(host::Valeur::depuisTexte(genre, value.chaine(), "essai").chaine() == value.chaine());
  }
}

void text(std::string_view input) {
  if (host::text::flaw(input)) return;
  std::size_t length = host::text::length(input);
  require(host::text::substring(input, 1, static_cast<long>(length)) == input);
  require(host::text::right(input, static_cast<long>(length)) == input);
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  std::string_view input(reinterpret_cast<const char*>(data), size);
  script(input);
  amount(input);
  day(input);
  typed(input);
  text(input);
  return 0;
}
