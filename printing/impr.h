// The print jobs of the six kinds: the form of one operation ("MIRVAE-IMPR_FICHE1"
// ... 6) and the list of an access screen's operations ("MIRVAE-IMPR_LISTE1" ... 6).
// A job only fills the variables that its layout prints (printing/layouts.h); the
// model's print job walks the records and the lines and hands them to the printer.
//
// Forms of kinds 1 to 5 name the operation's account with its address; the form of a
// miscellaneous operation, which has no such account, only titles its lines. Lists
// recover their heading (period, account, and for bank and cash the direction) from
// the request the access screen passed; bank and cash lists print a disbursement's
// amounts negated.
#pragma once

#include "host/table.h"
#include "model/impetat.h"

namespace printing {

// ---------------------------------------------------------------------------- forms

// Kinds 1 to 5.
class AccountFormPrint : public model::Edition_etat2 {
 public:
  void debut(host::Evt* e) override;
  void debut_fiche(host::Evt* e) override;
  void lst_corps_imprime(host::Evt* e);

 protected:
  explicit AccountFormPrint(host::Evt* e);
  void registerBranches();

  host::Chaine VNOM{"VNOM", "", "", 0, this};
  host::Chaine VADRESSE{"VADRESSE", "", "", 0, this};
  host::Chaine VADRESSE2{"VADRESSE2", "", "", 0, this};
  host::Chaine VCPVILLE{"VCPVILLE", "", "", 0, this};
  host::Chaine VLIBCP{"VLIBCP", "", "", 0, this};

  host::Table I_CPCOMPT{this, "", "I_CPCOMPT", ""};
  host::Table MIRVAL{this, "", "MIRVAL", ""};

  host::Champ NUMCP{this, "NUMCP", table(false)};
  host::Champ LIBCP{"LIBCP", &I_CPCOMPT};
  host::Champ ADRE1{"ADRE1", &I_CPCOMPT};
  host::Champ ADRE2{"ADRE2", &I_CPCOMPT};
  host::Champ CPOCP{"CPOCP", &I_CPCOMPT};
  host::Champ VILCP{"VILCP", &I_CPCOMPT};
  host::Champ MIRVAL_NUMCP{"NUMCP", &MIRVAL};
};

class MIRVAEImpr_fiche1 : public AccountFormPrint {
 public:
  explicit MIRVAEImpr_fiche1(host::Evt* e) : AccountFormPrint(e) { registerBranches(); }
};
class MIRVAEImpr_fiche2 : public AccountFormPrint {
 public:
  explicit MIRVAEImpr_fiche2(host::Evt* e) : AccountFormPrint(e) { registerBranches(); }
};
class MIRVAEImpr_fiche3 : public AccountFormPrint {
 public:
  explicit MIRVAEImpr_fiche3(host::Evt* e) : AccountFormPrint(e) { registerBranches(); }
};
class MIRVAEImpr_fiche4 : public AccountFormPrint {
 public:
  explicit MIRVAEImpr_fiche4(host::Evt* e) : AccountFormPrint(e) { registerBranches(); }
};
class MIRVAEImpr_fiche5 : public AccountFormPrint {
 public:
  explicit MIRVAEImpr_fiche5(host::Evt* e) : AccountFormPrint(e) { registerBranches(); }
};

// Kind 6.
class MIRVAEImpr_fiche6 : public model::Edition_etat2 {
 public:
  explicit MIRVAEImpr_fiche6(host::Evt* e);
  void debut(host::Evt* e) override;
  void debut_fiche(host::Evt* e) override;
  void lst_corps_imprime(host::Evt* e);

 private:
  host::Chaine VLIBCP{"VLIBCP", "", "", 0, this};
  host::Table MIRVAL{this, "", "MIRVAL", ""};
  host::Table I_CPCOMPT{this, "", "I_CPCOMPT", ""};
  host::Champ MIRVAL_NUMCP{"NUMCP", &MIRVAL};
  host::Champ LIBCP{"LIBCP", &I_CPCOMPT};
};

// ---------------------------------------------------------------------------- lists

// What every list shares: the request, the period and "CHERCHE".
class ListPrint : public model::Edition_etat2 {
 public:
  // "CHERCHE": parameter 0 a criterion by value ("DTOPE >="), parameter 1 by
  // reference receives the text between the quotes that follow it in the request
  // ("" when the request does not hold it written so).
  void cherche(host::Evt* e);

 protected:
  explicit ListPrint(host::Evt* e);
  // The request and its period: "..." for no lower bound, "31/12/9999" for no upper.
  void readPeriod();
  // The criterion's value, through "CHERCHE".
  void find(const char* criterion, host::Chaine& value);

  host::Chaine VREQUETE_SQL{"VREQUETE_SQL", "", "", 0, this};
  host::Chaine VDATEMIN{"VDATEMIN", "", "", 0, this};
  host::Chaine VDATEMAX{"VDATEMAX", "", "", 0, this};
};

// Kinds 1, 2 and 3.
class AccountListPrint : public ListPrint {
 public:
  void debut(host::Evt* e) override;
  void lst_corps_imprime(host::Evt* e);

 protected:
  explicit AccountListPrint(host::Evt* e);
  void registerBranches();

  host::Chaine VNUMCP{"VNUMCP", "", "", 0, this};
  host::Chaine VLIBCP{"VLIBCP", "", "", 0, this};
  host::Chaine VLIBCP1{"VLIBCP1", "", "", 0, this};
  host::Table I_CPCOMPT{this, "", "I_CPCOMPT", ""};
  host::Champ LIBCP{"LIBCP", &I_CPCOMPT};
  host::Champ NUMCP{this, "NUMCP", table(false)};
};

class MIRVAEImpr_liste1 : public AccountListPrint {
 public:
  explicit MIRVAEImpr_liste1(host::Evt* e) : AccountListPrint(e) { registerBranches(); }
};
class MIRVAEImpr_liste2 : public AccountListPrint {
 public:
  explicit MIRVAEImpr_liste2(host::Evt* e) : AccountListPrint(e) { registerBranches(); }
};
class MIRVAEImpr_liste3 : public AccountListPrint {
 public:
  explicit MIRVAEImpr_liste3(host::Evt* e) : AccountListPrint(e) { registerBranches(); }
};

// Kinds 4 and 5.
class TreasuryListPrint : public ListPrint {
 public:
  void debut(host::Evt* e) override;
  void lst_debut1_imprime(host::Evt* e);
  void lst_debut_fiche(host::Evt* e);

 protected:
  explicit TreasuryListPrint(host::Evt* e);
  void registerBranches();

  host::Chaine VNUMCP{"VNUMCP", "", "", 0, this};
  host::Chaine VLIBCP{"VLIBCP", "", "", 0, this};
  host::Chaine VLIBCP1{"VLIBCP1", "", "", 0, this};
  host::Chaine VTYPE{"VTYPE", "", "", 0, this};
  host::Chaine VTYPE_DR{"VTYPE_DR", "", "", 0, this};
  host::Monnaie VTTC{"VTTC", "", "", 0, this};
  host::Monnaie VTVA{"VTVA", "", "", 0, this};
  host::Monnaie VHT{"VHT", "", "", 0, this};
  host::Table I_CPCOMPT{this, "", "I_CPCOMPT", ""};
  host::Champ LIBCP{"LIBCP", &I_CPCOMPT};
  host::Champ NUMCP{this, "NUMCP", table(false)};
  host::Champ TYPE_DR{this, "TYPE_DR", table(false)};
  host::Champ TTC{this, "TTC", table(false)};
  host::Champ TVA{this, "TVA", table(false)};
  host::Champ HT{this, "HT", table(false)};
};

class MIRVAEImpr_liste4 : public TreasuryListPrint {
 public:
  explicit MIRVAEImpr_liste4(host::Evt* e) : TreasuryListPrint(e) { registerBranches(); }
};
class MIRVAEImpr_liste5 : public TreasuryListPrint {
 public:
  explicit MIRVAEImpr_liste5(host::Evt* e) : TreasuryListPrint(e) { registerBranches(); }
};

// Kind 6.
class MIRVAEImpr_liste6 : public ListPrint {
 public:
  explicit MIRVAEImpr_liste6(host::Evt* e);
  void debut(host::Evt* e) override;
  void lst_corps_imprime(host::Evt* e);
};

}  // namespace printing
