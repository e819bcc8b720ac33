// "MIRVAE-GESTION3": the entry screen of staff expense notes. The counterparty is a
// member of staff or a supplier, chosen first; a line's label may be an expense type
// or the previous line's; there are no entry models.
#pragma once

#include <string>

#include "entry/parts.h"

namespace entry {

// The counterparty of an expense note: a member of staff (VTIERS "P": an account of
// nature "A" whose number begins with "421") or a supplier ("F": nature "F").
class StaffOrSupplier : public HeaderAccount {
 public:
  explicit StaffOrSupplier(EntryScreen& screen);

  void provide(Handlers& handlers) override;
  void started() override;
  void creationStarted() override;
  void opened() override;
  void compt1_choisir(Evt* e) override;

  void vtiers1(Evt* e);
  void vtiers1_ferme(Evt* e);
  void fait_inpie(Evt* e);
  // The piece label by the type of counterparty.
  std::string label() const;

  Chaine VTIERS{"VTIERS", "", "", 0, &s_};
  Chaine VTIERS1{"VTIERS1", "", "", 0, &s_};
  Chaine VTIERS_ANC{"VTIERS_ANC", "", "", 0, &s_};
  Table COMPT1P{&s_, "", "COMPT", "COMPT1P"};
  Table COMPT1F{&s_, "", "COMPT", "COMPT1F"};
  Champ COMPT1P_NUMCP{"NUMCP", &COMPT1P};
  Champ COMPT1P_LIBCP{"LIBCP", &COMPT1P};
  Champ COMPT1P_NATUC{"NATUC", &COMPT1P};
  Champ COMPT1P_CCTRA{"CCTRA", &COMPT1P};
  Champ COMPT1F_NATUC{"NATUC", &COMPT1F};
  Champ COMPT1F_CCTRA{"CCTRA", &COMPT1F};

 protected:
  std::string nature() override { return VTIERS == "P" ? "A" : "F"; }
};

}  // namespace entry

class MIRVAEGestion3 : public entry::EntryScreen {
 public:
  explicit MIRVAEGestion3(host::Evt* e);

  // Expenses stand on the debit.
  bool lineOnDebit() override { return true; }
  std::string defaultLabel() override { return header_.label(); }
  void ctrl_ouvre(host::Evt* e) override;

  void typfr_choisir(host::Evt* e);
  void lst_mirval_libec(host::Evt* e);
  void lire_ligne_precedente(host::Evt* e);

 private:
  void provide(entry::Handlers& handlers) override;

  entry::StaffOrSupplier header_{*this};
  entry::AccountOfNature lineAccount_{*this};
  entry::VatTotals totals_{*this};
  entry::PrintAfterSaving print_{*this};
  host::Table TYPFR{this, "", "TYPFR", ""};
  host::Champ TYPFR_CTYFR{"CTYFR", &TYPFR};
  host::Champ TYPFR_ITYFR{"ITYFR", &TYPFR};
  host::Champ MEM_MIRVAL_IDENT{"IDENT", &MEM_MIRVAL};
  host::Champ MEM_MIRVAL_NUMERO{"NUMERO", &MEM_MIRVAL};
  host::Champ MEM_MIRVAL_LIBEC{"LIBEC", &MEM_MIRVAL};
};
