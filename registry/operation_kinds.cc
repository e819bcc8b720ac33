#include "registry/operation_kinds.h"

#include <string>

#include "host/error.h"

namespace registry {

namespace {

constexpr std::array<const char*, 4> kChoicesWithPrint = {
    "1~Enregistrer", "2Enregistrer et ~Créer une nouvelle pièce", "3Enregistrer et ~Imprimer", "0~Abandonner"};
constexpr std::array<const char*, 4> kChoicesWithoutPrint = {
    "1~Enregistrer", "2Enregistrer et ~Créer une nouvelle pièce", "0~Abandonner", nullptr};

constexpr const char* kNoPurchaseJournal = "Aucun journal de nature Achat n'a été défini!@Opération impossible.";
constexpr const char* kNoTreasuryJournal =
    "Aucun journal de nature Trésorerie n'a été défini!@Opération impossible.";

// Where a kind decides per operation (the expense note by its type of counterparty,
// bank and cash by their direction), the row holds the value of a new operation and
// the kind's own handlers choose the others.
const OperationKind kKinds[] = {
    {.number = 1,
     .type = "FC",
     .journalNature = "V",
     .noJournal = "Aucun journal de nature Vente n'a été défini!@Opération impossible.",
     .headerNature = "C",
     .lineNature = "P",
     .vatCodeFilter = '=',
     .vatCodeType = "V",
     .vatChoiceType = "V",
     .defaultLabel = "Facture client n° [PIECE]",
     .amountTyped = "1",
     .journal = CreationJournal::FirstOfNature,
     .currency = CreationCurrency::Dossier,
     .dueDate = CreationDueDate::OperationDate,
     .choices = kChoicesWithPrint,
     .headerRequired = "La saisie d'un client est obligatoire !",
     .headerMissing = "Le compte Client est inexistant !",
     .headerUnknownOpen = "Compte Client <",
     .rowUnknownTitle = "Client <",
     .lineAccountRequired = "La saisie d'un compte produit est obligatoire !"},
    {.number = 2,
     .type = "FF",
     .journalNature = "A",
     .noJournal = kNoPurchaseJournal,
     .headerNature = "F",
     .lineNature = "H",
     .vatCodeFilter = '#',
     .vatCodeType = "V",
     .vatChoiceType = "A",
     .defaultLabel = "Facture fournisseur n° [PIECE]",
     .amountTyped = "1",
     .journal = CreationJournal::FirstOfNature,
     .currency = CreationCurrency::Dossier,
     .dueDate = CreationDueDate::Today,
     .choices = kChoicesWithPrint,
     .headerRequired = "La saisie d'un fournisseur est obligatoire !",
     .headerMissing = "Le compte Fournisseur est inexistant !",
     .headerUnknownOpen = "Compte Fournisseur <",
     .rowUnknownTitle = "Fournisseur <",
     .lineAccountRequired = "La saisie d'un compte charge est obligatoire !"},
    {.number = 3,
     .type = "NDF",
     .journalNature = "A",
     .noJournal = kNoPurchaseJournal,
     .headerNature = "A",
     .lineNature = "H",
     .vatCodeFilter = '=',
     .vatCodeType = "A",
     .vatChoiceType = "A",
     .defaultLabel = "Note de frais personnel n° [PIECE]",
     .amountTyped = "1",
     .journal = CreationJournal::FirstOfNature,
     .currency = CreationCurrency::Dossier,
     .dueDate = CreationDueDate::Today,
     .choices = kChoicesWithPrint,
     .headerRequired = "La saisie d'un tiers est obligatoire !",
     .headerMissing = "Le compte Tiers est inexistant !",
     .headerUnknownOpen = "Compte Tiers <",
     .rowUnknownTitle = "Tiers <",
     .lineAccountRequired = "La saisie d'un compte charge est obligatoire !",
     .lineAccountPattern = "625*"},
    {.number = 4,
     .type = "BQ",
     .journalNature = "T",
     .noJournal = kNoTreasuryJournal,
     .headerNature = "B",
     .lineNature = "",
     .vatCodeFilter = 0,
     .vatCodeType = "",
     .vatChoiceType = "V",
     .defaultLabel = "Opération bancaire",
     .amountTyped = "2",
     .journal = CreationJournal::OfFirstTreasury,
     .currency = CreationCurrency::Journal,
     .dueDate = CreationDueDate::None,
     .choices = kChoicesWithoutPrint,
     .headerRequired = "La saisie d'une banque est obligatoire !",
     .headerMissing = "Le compte Banque est inexistant !",
     .headerUnknownOpen = "Compte Banque <",
     .rowUnknownTitle = "Banque <",
     .lineAccountRequired = "",
     .accountWithoutJournal = "Le compte Banque n'est affecté à aucun journal de trésorerie !"},
    {.number = 5,
     .type = "CA",
     .journalNature = "T",
     .noJournal = kNoTreasuryJournal,
     .headerNature = "I",
     .lineNature = "",
     .vatCodeFilter = 0,
     .vatCodeType = "",
     .vatChoiceType = "V",
     .defaultLabel = "Opération de caisse",
     .amountTyped = "2",
     .journal = CreationJournal::OfFirstTreasury,
     .currency = CreationCurrency::Journal,
     .dueDate = CreationDueDate::None,
     .choices = kChoicesWithoutPrint,
     .headerRequired = "La saisie d'une caisse est obligatoire !",
     .headerMissing = "Le compte Caisse est inexistant !",
     .headerUnknownOpen = "Compte Caisse <",
     .rowUnknownTitle = "Caisse <",
     .lineAccountRequired = "",
     .accountWithoutJournal = "Le compte Caisse n'est affecté à aucun journal de trésorerie !"},
    {.number = 6,
     .type = "OD",
     .journalNature = "O",
     .noJournal = "Aucun journal de nature OD n'a été défini!@Opération impossible.",
     .headerNature = "",
     .lineNature = "",
     .vatCodeFilter = 0,
     .vatCodeType = "",
     .vatChoiceType = "V",
     .defaultLabel = "Opération diverse",
     .amountTyped = "2",
     .journal = CreationJournal::FirstOfNature,
     .currency = CreationCurrency::Journal,
     .dueDate = CreationDueDate::None,
     .choices = kChoicesWithoutPrint,
     .headerRequired = "",
     .headerMissing = "",
     .headerUnknownOpen = "",
     .rowUnknownTitle = "",
     .lineAccountRequired = ""},
};

}  // namespace

const OperationKind& operationKind(int number) {
  for (const OperationKind& kind : kKinds)
    if (kind.number == number) return kind;
  throw host::HostError("type d'opération « " + std::to_string(number) + " » inconnu (1 à 6 attendu)");
}

ShownBalance shownBalance(const host::Decimal& debitMinusCredit) {
  if (debitMinusCredit < host::Decimal()) return {-debitMinusCredit, "C"};
  return {debitMinusCredit, debitMinusCredit.isZero() ? "" : "D"};
}

}  // namespace registry
