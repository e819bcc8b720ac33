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

using namespace host;

// ---------------------------------------------------------------------------- forms

// Kinds 1 to 5.
class AccountFormPrint : public model::Edition_etat2 {
 public:
  void debut(Evt* e) override;
  void debut_fiche(Evt* e) override;
  void lst_corps_imprime(Evt* e);

 protected:
  explicit AccountFormPrint(Evt* e);
  void registerBranches();

  Chaine VNOM{"VNOM", "", "", 0, this};
  Chaine VADRESSE{"VADRESSE", "", "", 0, this};
  Chaine VADRESSE2{"VADRESSE2", "", "", 0, this};
  Chaine VCPVILLE{"VCPVILLE", "", "", 0, this};
  Chaine VLIBCP{"VLIBCP", "", "", 0, this};

  Table I_CPCOMPT{this, "", "I_CPCOMPT", ""};
  Table MIRVAL{this, "", "MIRVAL", ""};

  Champ NUMCP{this, "NUMCP", table(false)};
  Champ LIBCP{"LIBCP", &I_CPCOMPT};
  Champ ADRE1{"ADRE1", &I_CPCOMPT};
  Champ ADRE2{"ADRE2", &I_CPCOMPT};
  Champ CPOCP{"CPOCP", &I_CPCOMPT};
  Champ VILCP{"VILCP", &I_CPCOMPT};
  Champ MIRVAL_NUMCP{"NUMCP", &MIRVAL};
};

class MIRVAEImpr_fiche1 : public AccountFormPrint {
 public:
  explicit MIRVAEImpr_fiche1(Evt* e) : AccountFormPrint(e) { registerBranches(); }
};
class MIRVAEImpr_fiche2 : public AccountFormPrint {
 public:
  explicit MIRVAEImpr_fiche2(Evt* e) : AccountFormPrint(e) { registerBranches(); }
};
class MIRVAEImpr_fiche3 : public AccountFormPrint {
 public:
  explicit MIRVAEImpr_fiche3(Evt* e) : AccountFormPrint(e) { registerBranches(); }
};
class MIRVAEImpr_fiche4 : public AccountFormPrint {
 public:
  explicit MIRVAEImpr_fiche4(Evt* e) : AccountFormPrint(e) { registerBranches(); }
};
class MIRVAEImpr_fiche5 : public AccountFormPrint {
 public:
  explicit MIRVAEImpr_fiche5(Evt* e) : AccountFormPrint(e) { registerBranches(); }
};

// Kind 6.
class MIRVAEImpr_fiche6 : public model::Edition_etat2 {
 public:
  explicit MIRVAEImpr_fiche6(Evt* e);
  void debut(Evt* e) override;
  void debut_fiche(Evt* e) override;
  void lst_corps_imprime(Evt* e);

 private:
  Chaine VLIBCP{"VLIBCP", "", "", 0, this};
  Table MIRVAL{this, "", "MIRVAL", ""};
  Table I_CPCOMPT{this, "", "I_CPCOMPT", ""};
  Champ MIRVAL_NUMCP{"NUMCP", &MIRVAL};
  Champ LIBCP{"LIBCP", &I_CPCOMPT};
};

// ---------------------------------------------------------------------------- lists

// What every list shares: the request, the period and "CHERCHE".
class ListPrint : public model::Edition_etat2 {
 public:
  // "CHERCHE": parameter 0 a criterion by value ("DTOPE >="), parameter 1 by
  // reference receives the text between the quotes that follow it in the request
  // ("" when the request does not hold it written so).
  void cherche(Evt* e);

 protected:
  explicit ListPrint(Evt* e);
  // The request and its period: "..." for no lower bound, "31/12/9999" for no upper.
  void readPeriod();
  // The criterion's value, through "CHERCHE".
  void find(const char* criterion, Chaine& value);

  Chaine VREQUETE_SQL{"VREQUETE_SQL", "", "", 0, this};
  Chaine VDATEMIN{"VDATEMIN", "", "", 0, this};
  Chaine VDATEMAX{"VDATEMAX", "", "", 0, this};
};

// Kinds 1, 2 and 3.
class AccountListPrint : public ListPrint {
 public:
  void debut(Evt* e) override;
  void lst_corps_imprime(Evt* e);

 protected:
  explicit AccountListPrint(Evt* e);
  void registerBranches();

  Chaine VNUMCP{"VNUMCP", "", "", 0, this};
  Chaine VLIBCP{"VLIBCP", "", "", 0, this};
  Chaine VLIBCP1{"VLIBCP1", "", "", 0, this};
  Table I_CPCOMPT{this, "", "I_CPCOMPT", ""};
  Champ LIBCP{"LIBCP", &I_CPCOMPT};
  Champ NUMCP{this, "NUMCP", table(false)};
};

class MIRVAEImpr_liste1 : public AccountListPrint {
 public:
  explicit MIRVAEImpr_liste1(Evt* e) : AccountListPrint(e) { registerBranches(); }
};
class MIRVAEImpr_liste2 : public AccountListPrint {
 public:
  explicit MIRVAEImpr_liste2(Evt* e) : AccountListPrint(e) { registerBranches(); }
};
class MIRVAEImpr_liste3 : public AccountListPrint {
 public:
  explicit MIRVAEImpr_liste3(Evt* e) : AccountListPrint(e) { registerBranches(); }
};

// Kinds 4 and 5.
class TreasuryListPrint : public ListPrint {
 public:
  void debut(Evt* e) override;
  void lst_debut1_imprime(Evt* e);
  void lst_debut_fiche(Evt* e);

 protected:
  explicit TreasuryListPrint(Evt* e);
  void registerBranches();

  Chaine VNUMCP{"VNUMCP", "", "", 0, this};
  Chaine VLIBCP{"VLIBCP", "", "", 0, this};
  Chaine VLIBCP1{"VLIBCP1", "", "", 0, this};
  Chaine VTYPE{"VTYPE", "", "", 0, this};
  Chaine VTYPE_DR{"VTYPE_DR", "", "", 0, this};
  Monnaie VTTC{"VTTC", "", "", 0, this};
  Monnaie VTVA{"VTVA", "", "", 0, this};
  Monnaie VHT{"VHT", "", "", 0, this};
  Table I_CPCOMPT{this, "", "I_CPCOMPT", ""};
  Champ LIBCP{"LIBCP", &I_CPCOMPT};
  Champ NUMCP{this, "NUMCP", table(false)};
  Champ TYPE_DR{this, "TYPE_DR", table(false)};
  Champ TTC{this, "TTC", table(false)};
  Champ TVA{this, "TVA", table(false)};
  Champ HT{this, "HT", table(false)};
};

class MIRVAEImpr_liste4 : public TreasuryListPrint {
 public:
  explicit MIRVAEImpr_liste4(Evt* e) : TreasuryListPrint(e) { registerBranches(); }
};
class MIRVAEImpr_liste5 : public TreasuryListPrint {
 public:
  explicit MIRVAEImpr_liste5(Evt* e) : TreasuryListPrint(e) { registerBranches(); }
};

// Kind 6.
class MIRVAEImpr_liste6 : public ListPrint {
 public:
  explicit MIRVAEImpr_liste6(Evt* e);
  void debut(Evt* e) override;
  void lst_corps_imprime(Evt* e);
};

}  // namespace printing
