// The analytic breakdown of one operation line: the line's amount spread over
// analytic sections, one row per section, typed by hand or proposed by a
// distribution key. The rows live in the work table MIRVAANA_M01 and belong to the
// line through NUMERO, which begins with the line's IDENT and "|" and goes on with
// the row's own order, so that every row of a line has a NUMERO of its own.
//
// The caller passes the line's amount on one side (debit or credit) and gets back the
// post and the key chosen; the rows stay in MIRVAANA_M01 for the caller to keep.
#pragma once

#include <functional>
#include <string>

#include "host/table.h"
#include "model/gestion_document.h"

namespace analytic {

using namespace host;

class MIRVAEGest_ana : public model::Gestion_document2 {
 public:
  explicit MIRVAEGest_ana(Evt* e);

  void init(Evt* e) override;
  void debut(Evt* e) override;
  void v_cpost(Evt* e);
  void cppoana_choisir(Evt* e);
  void v_ccrit(Evt* e);
  void cpcrita_choisir(Evt* e);
  void selection(Evt* e) override;
  void ctrl_debut_ligne(Evt* e) override;
  void debut_creation_ligne(Evt* e) override;
  void lst_mirvaana_m01_csect(Evt* e);
  void cpsecan_choisir(Evt* e);
  void validation(Evt* e) override;
  void apres_validation(Evt* e) override;
  void b_aband_doc(Evt* e);
  void apres_abandon(Evt* e) override;
  void validation_ligne(Evt* e) override;
  void apres_validation_ligne(Evt* e) override;
  void apres_suppression_ligne(Evt* e) override;
  void bt_solde(Evt* e);
  void calcul_total_ventile(Evt* e);
  void sections_par_cle(Evt* e);
  void creat_ventilation_auto(Evt* e);
  void modif_ventilation_auto(Evt* e);
  void ctrl_choisir(Evt* e) override;

  // ---- launch parameters
  Chaine PIDENT{"PIDENT", "", "", 0, this};
  Chaine PMODE{"PMODE", "", "", 0, this};
  Date P_DTOPE{"P_DTOPE", "", "", 0, this};
  Double P_COURS{"P_COURS", "", "", 0, this};
  Chaine P_CPOST{"P_CPOST", "Code Poste attribué au compte", "!(9)", 0, this};
  Chaine P_CCRIT{"P_CCRIT", "Code Critère attribué au compte", "!(9)", 0, this};
  Chaine P_CSECT{"P_CSECT", "", "", 0, this};
  Monnaie P_MTDEBS{"P_MTDEBS", "Montant Débit en monnaie de saisie", "", 0, this};
  Monnaie P_MTCRES{"P_MTCRES", "Montant Crédit en monnaie de saisie", "", 0, this};
  Entier P_SIGNE{"P_SIGNE", "", "", 0, this};
  Chaine P_SAISIE_OBLIGATOIRE{"P_SAISIE_OBLIGATOIRE", "", "", 0, this};

  // ---- screen variables
  Chaine V_CPOST{"V_CPOST", "", "", 0, this};
  Chaine V_CCRIT{"V_CCRIT", "", "", 0, this};
  Monnaie V_MTLIG{"V_MTLIG", "", "", 0, this};
  Monnaie V_MTANA{"V_MTANA", "", "", 0, this};
  Monnaie V_TOT_ANA{"V_TOT_ANA", "", "", 0, this};
  Monnaie V_RESTE_ANA{"V_RESTE_ANA", "", "", 0, this};
  Monnaie V_TOT_DEBS{"V_TOT_DEBS", "Cumul Débit ventilé en monnaie de saisie", "", 0, this};
  Monnaie V_TOT_CRES{"V_TOT_CRES", "Cumul Crédit ventilé en monnaie de saisie", "", 0, this};
  Monnaie V_RESTE_DEBS{"V_RESTE_DEBS", "Cumul Débit restant à ventiler", "", 0, this};
  Monnaie V_RESTE_CRES{"V_RESTE_CRES", "Cumul Crédit restant à ventiler", "", 0, this};
  Entier V_CHOIX{"V_CHOIX", "", "", 0, this};

  // ---- tables
  Table MIRVAANA_M01{this, "", "MIRVAANA_M01", ""};
  Table MEM_MIRVAANA{this, "", "MEM:MIRVAANA_M01", "MEM_MIRVAANA"};
  Table MEM_MIRVAANA2{this, "", "MEM:MIRVAANA_M01", "MEM_MIRVAANA2"};
  Table PARAM{this, "", "PARAM", ""};
  Table I_CPPOANA{this, "", "I_CPPOANA", ""};
  Table I_CPCRITA{this, "", "I_CPCRITA", ""};
  Table I_CPSECAN{this, "", "I_CPSECAN", ""};
  Table VENSE{this, "", "VENSE", ""};

  // ---- fields
  Champ PARAM_PNUME{"PNUME", &PARAM};
  Champ PARAM_MONNAIE_IDENT{"MONNAIE_IDENT", &PARAM};
  Champ MIRVAL_M01_IDENT{this, "IDENT", table(false)};
  Champ MIRVAANA_M01_IDENT{"IDENT", &MIRVAANA_M01};
  Champ MIRVAANA_M01_NUMERO{"NUMERO", &MIRVAANA_M01};
  Champ MIRVAANA_M01_CSECT{"CSECT", &MIRVAANA_M01};
  Champ MIRVAANA_M01_MTADE{"MTADE", &MIRVAANA_M01};
  Champ MIRVAANA_M01_MTACR{"MTACR", &MIRVAANA_M01};
  Champ MEM_MIRVAANA_NUMERO{"NUMERO", &MEM_MIRVAANA};
  Champ MEM_MIRVAANA_CSECT{"CSECT", &MEM_MIRVAANA};
  Champ MEM_MIRVAANA_MTADE{"MTADE", &MEM_MIRVAANA};
  Champ MEM_MIRVAANA_MTACR{"MTACR", &MEM_MIRVAANA};
  Champ MEM_MIRVAANA2_NUMERO{"NUMERO", &MEM_MIRVAANA2};
  Champ MEM_MIRVAANA2_CSECT{"CSECT", &MEM_MIRVAANA2};
  Champ MEM_MIRVAANA2_MTADE{"MTADE", &MEM_MIRVAANA2};
  Champ MEM_MIRVAANA2_MTACR{"MTACR", &MEM_MIRVAANA2};
  Champ I_CPPOANA_IDENT{"IDENT", &I_CPPOANA};
  Champ I_CPPOANA_LPOST{"LPOST", &I_CPPOANA};
  Champ I_CPCRITA_IDENT{"IDENT", &I_CPCRITA};
  Champ I_CPCRITA_LCRIT{"LCRIT", &I_CPCRITA};
  Champ I_CPSECAN_SCLOT{"SCLOT", &I_CPSECAN};
  Champ I_CPSECAN_CLOAN{"CLOAN", &I_CPSECAN};
  Champ I_CPSECAN_DTOUV{"DTOUV", &I_CPSECAN};
  Champ I_CPSECAN_DTCLO{"DTCLO", &I_CPSECAN};
  Champ I_CPSECAN_LSECT{"LSECT", &I_CPSECAN};
  Champ VENSE_CCRIT{"CCRIT", &VENSE};
  Champ VENSE_CSECT{"CSECT", &VENSE};
  Champ VENSE_MTVEN{"MTVEN", &VENSE};

 private:
  bool consultation() const { return modeCourant() == "V"; }
  bool debitMovement() const { return P_MTDEBS != 0; }
  Decimal movement() const { return debitMovement() ? P_MTDEBS.decimal() : P_MTCRES.decimal(); }
  Champ& sideOf(Champ& mtade, Champ& mtacr) const { return debitMovement() ? mtade : mtacr; }
  void messageOk(const std::string& text);
  void refuser(Evt* e, const std::string& message, const char* control);
  // Runs `procedure` ("LECTURE" or "CHOIX") of the module of `record` on `code`, then
  // reads the record it left; false (blank record) when there is none.
  bool lire(const char* module, const char* procedure, Donnee& code, Table& record);
  void nouvelIdentifiant(Donnee& ident);
  void openForChange();
  // Why a key's section is left out of a spread ("" when it is taken).
  std::string keySectionRefusal(const std::string& section);
  // The key's spread: for each section kept, `add` gets the section and its amount.
  void spreadByKey(const std::function<void(const std::string&, const Decimal&)>& add);
  // Puts on the first row of `rows` (a cursor on the line's rows) what the rows lack
  // or exceed against the movement.
  void firstRowTakesRemainder(Table& rows, Champ& mtade, Champ& mtacr);
  // Selects the line's stored rows.
  void selectStoredRows();
  void selectImage(Table& image);
};

}  // namespace analytic
