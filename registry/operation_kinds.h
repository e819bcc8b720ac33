// The six kinds of operation (1 client invoice, 2 supplier invoice, 3 staff expense
// note, 4 bank, 5 cash, 6 miscellaneous operation): one row of constants and texts
// per kind, read alike by the browsers, the entry screens, the posting processes and
// the prints. Each of those shares one implementation across the kinds; what differs
// and is data lives here, and the few rules that are not data are functions of the
// kind's own class.
#pragma once

#include <array>
#include <string>

#include "host/decimal.h"

namespace registry {

// Currency proposed to a new operation.
enum class CreationCurrency {
  Dossier,  // PARAM.MONNAIE_IDENT
  Journal,  // the journal's own currency (treasury and miscellaneous journals)
};

// Journal given to a new operation.
enum class CreationJournal {
  FirstOfNature,    // the first journal of journalNature, by number
  OfFirstTreasury,  // the journal whose CPTRE is the first account of headerNature
};

// Due date given to a new operation.
enum class CreationDueDate {
  OperationDate,  // DTECH := DTOPE
  Today,
  None,
};

struct OperationKind {
  int number;                 // the digit that ends the module, screen and print names
  // MIRVAE.TYPE: written on creation, the only one a kind's screens show, and the end
  // of its posting module's name ("FC" ... "OD").
  const char* type;
  const char* journalNature;  // JONAL.TYPJL of the journals proposed
  const char* noJournal;      // shown when the dossier has no journal of that nature
  const char* headerNature;   // nature letter of the header account ("" when none)
  const char* lineNature;     // nature letters of the line accounts
  // Filter of the VAT codes offered at start on CDTVA.TYTVA: '=' or '#' against
  // vatCodeType, or 0 when every code is offered.
  char vatCodeFilter;
  const char* vatCodeType;
  const char* vatChoiceType;  // VAT type given to the VAT code choice window
  const char* defaultLabel;   // INPIE of a new operation when the journal has no label prefix
  const char* amountTyped;    // SAISIE_MTT on creation: "1" excluding tax, "2" including tax
  CreationJournal journal;
  CreationCurrency currency;
  CreationDueDate dueDate;
  // Choices of the validation dialog of a creation; the leading digit is the answer.
  std::array<const char*, 4> choices;  // unused trailing entries are nullptr
  // Messages that name the header account.
  const char* headerRequired;     // no header account at validation
  const char* headerMissing;      // header account typed that does not exist
  const char* headerUnknownOpen;  // opened record whose account is gone: + number + "> inexistant !"
  const char* rowUnknownTitle;    // a browser's row whose account is gone: + number + "> inexistant !"
  const char* lineAccountRequired;
  // Pattern the line account choice window opens with ("625*"), "" for none.
  const char* lineAccountPattern = "";
  // A bank or cash account chosen that no treasury journal keeps.
  const char* accountWithoutJournal = "";

  // Names, made from the digit and the type.
  std::string accessModule() const { return "MIRVAE-ACCES" + std::to_string(number); }  // registry name
  std::string accessScreen() const { return "+ACCES" + std::to_string(number); }
  std::string entryModule() const { return "GESTION" + std::to_string(number); }  // in library "MIRVAE"
  std::string entryScreen() const { return "+GESTION" + std::to_string(number); }
  std::string postingModule() const { return std::string("CREER_PIECE_") + type; }  // in library "MIRVAE"
  std::string printForm() const { return "fiche" + std::to_string(number); }
  std::string printList() const { return "liste" + std::to_string(number); }
};

// The row of kind `number` (1 to 6); HostError for any other number.
const OperationKind& operationKind(int number);

// A bank or cash account's balance as the treasury screens show it: the amount
// without its sign, and its side, "D" for a debit balance, "C" for a credit one, ""
// when it is zero.
struct ShownBalance {
  host::Decimal amount;
  const char* side;
};
ShownBalance shownBalance(const host::Decimal& debitMinusCredit);

}  // namespace registry
