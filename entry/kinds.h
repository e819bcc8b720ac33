// What differs between the six entry screens: one row of constants and texts per
// operation kind (1 client invoice ... 6 miscellaneous operation). The screens share
// one implementation (entry/gestion.h); everything kind-specific that is data lives
// here, so a new kind is a new row plus the few handlers it adds or drops.
#pragma once

#include <array>

namespace entry {

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

struct EntryKind {
  int number;                 // the digit that ends the module names
  const char* type;           // MIRVAE.TYPE written on creation, and the only one shown
  const char* screen;         // screen description ("+GESTION1")
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
  const char* postingModule;  // module of library "MIRVAE" run after each save
  const char* printForm;      // form name given to the print procedure
  bool models;                // entry models offered (MODTE, MODLI)
  // Choices of the validation dialog of a creation; the leading digit is the answer.
  std::array<const char*, 4> choices;  // unused trailing entries are nullptr
  // Messages that name the header account.
  const char* headerRequired;     // no header account at validation
  const char* headerMissing;      // header account typed that does not exist
  const char* headerUnknownOpen;  // opened record whose account is gone: + number + "> inexistant !"
  const char* lineAccountRequired;
};

// The row of kind `number` (1 to 6); HostError for any other number.
const EntryKind& entryKind(int number);

}  // namespace entry
