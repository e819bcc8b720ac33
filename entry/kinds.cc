#include "entry/kinds.h"

#include <string>

#include "host/error.h"

namespace entry {

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
const EntryKind kKinds[] = {
    {1, "FC", "+GESTION1", "V", "Aucun journal de nature Vente n'a été défini!@Opération impossible.", "C", "P",
     '=', "V", "V", "Facture client n° [PIECE]", "1", CreationCurrency::Dossier, CreationDueDate::OperationDate,
     "CREER_PIECE_FC", "fiche1", true, kChoicesWithPrint, "La saisie d'un client est obligatoire !",
     "Le compte Client est inexistant !", "Compte Client <", "La saisie d'un compte produit est obligatoire !"},
    {2, "FF", "+GESTION2", "A", kNoPurchaseJournal, "F", "H", '#', "V", "A", "Facture fournisseur n° [PIECE]", "1",
     CreationCurrency::Dossier, CreationDueDate::Today, "CREER_PIECE_FF", "fiche2", true, kChoicesWithPrint,
     "La saisie d'un fournisseur est obligatoire !", "Le compte Fournisseur est inexistant !",
     "Compte Fournisseur <", "La saisie d'un compte charge est obligatoire !"},
    {3, "NDF", "+GESTION3", "A", kNoPurchaseJournal, "A", "H", '=', "A", "A", "Note de frais personnel n° [PIECE]",
     "1", CreationCurrency::Dossier, CreationDueDate::Today, "CREER_PIECE_NDF", "fiche3", false, kChoicesWithPrint,
     "La saisie d'un tiers est obligatoire !", "Le compte Tiers est inexistant !", "Compte Tiers <",
     "La saisie d'un compte charge est obligatoire !"},
    {4, "BQ", "+GESTION4", "T", kNoTreasuryJournal, "B", "", 0, "", "V", "Opération bancaire", "2",
     CreationCurrency::Journal, CreationDueDate::None, "CREER_PIECE_BQ", "fiche4", true, kChoicesWithoutPrint,
     "La saisie d'une banque est obligatoire !", "Le compte Banque est inexistant !", "Compte Banque <", ""},
    {5, "CA", "+GESTION5", "T", kNoTreasuryJournal, "I", "", 0, "", "V", "Opération de caisse", "2",
     CreationCurrency::Journal, CreationDueDate::None, "CREER_PIECE_CA", "fiche5", true, kChoicesWithoutPrint,
     "La saisie d'une caisse est obligatoire !", "Le compte Caisse est inexistant !", "Compte Caisse <", ""},
    {6, "OD", "+GESTION6", "O", "Aucun journal de nature OD n'a été défini!@Opération impossible.", "", "", 0, "",
     "V", "Opération diverse", "2", CreationCurrency::Journal, CreationDueDate::None, "CREER_PIECE_OD", "fiche6",
     true, kChoicesWithoutPrint, "", "", "", ""},
};

}  // namespace

const EntryKind& entryKind(int number) {
  for (const EntryKind& kind : kKinds)
    if (kind.number == number) return kind;
  throw host::HostError("type d'opération « " + std::to_string(number) + " » inconnu (1 à 6 attendu)");
}

}  // namespace entry
