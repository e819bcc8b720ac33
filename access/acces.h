// The access screens: the operations of one kind for a period, filtered by account,
// piece number and posting state, with the actions that open the entry screen,
// print, and show the ledger piece.
//
// MIRVAEAcces holds the whole behaviour; a kind's screen passes its row of the
// operation-kind table.
#pragma once

#include "registry/operation_kinds.h"
#include "host/table.h"
#include "model/acces.h"

namespace browser {

using namespace host;

class MIRVAEAcces : public model::Acces2 {
 public:
  MIRVAEAcces(Evt* e, const registry::OperationKind& kind);

  void init(Evt* e) override;
  void debut_activation(Evt* e) override;
  void active_requete(Evt* e) override;
  void avant_debut(Evt* e) override;
  void debut(Evt* e) override;
  void vmoian_selection(Evt* e);
  void vmoian(Evt* e);
  void vmoian_ferme(Evt* e);
  void calculer_dates(Evt* e);
  void vdate_debut(Evt* e);
  void vdate_fin(Evt* e);
  void vimput(Evt* e);
  void vnumcp_tous(Evt* e);
  void vlibcp1(Evt* e);
  void compt1_choisir(Evt* e);
  void vnpiec_tous(Evt* e);
  void vnpiec(Evt* e);
  void lst_liste_vide(Evt* e);
  void lst_liste_pleine(Evt* e);
  void lst_selection(Evt* e);
  void gerer(Evt* e) override;
  void modifier(Evt* e) override;
  void creer(Evt* e) override;
  void impr_fiche(Evt* e) override;
  void impr_liste(Evt* e) override;
  void controler_dossier(Evt* e);
  void visu_piece(Evt* e);

  const registry::OperationKind& kind() const { return kind_; }

 protected:
  const registry::OperationKind& kind_;

  // Variables
  Chaine VMOIAN{"VMOIAN", "", "", 0, this};
  Chaine MOANO_CHEV{"MOANO_CHEV", "Période de chevauchement O/N pour combo Mois/Année", "", 0, this};
  Date VDATE_DEBUT{"VDATE_DEBUT", "", "", 0, this};
  Date VDATE_FIN{"VDATE_FIN", "", "", 0, this};
  Date VDATE_MIN{"VDATE_MIN", "", "", 0, this};
  Date VDATE_MAX{"VDATE_MAX", "", "", 0, this};
  Chaine VIMPUT{"VIMPUT", "", "", 0, this};
  Chaine VNUMCP_TOUS{"VNUMCP_TOUS", "", "", 0, this};
  Chaine VNUMCP1{"VNUMCP1", "", "", 0, this};
  Chaine VLIBCP1{"VLIBCP1", "", "", 0, this};
  Chaine VNPIEC_TOUS{"VNPIEC_TOUS", "", "", 0, this};
  Chaine VNPIEC{"VNPIEC", "", "", 0, this};
  Chaine VETAT{"VETAT", "", "", 0, this};
  Chaine VLIBCP2{"VLIBCP2", "", "", 0, this};
  Chaine VIDENT{"VIDENT", "", "", 0, this};
  Date DATE_CLOTURE{"DATE_CLOTURE", "Date de clôture", "8", 0, this};
  Date DATE_DEBUT_NOUVEL_E{"DATE_DEBUT_NOUVEL_E", "Date de début du nouvel exercice", "8", 0, this};

  // Tables
  Table COMPT1{this, "", "COMPT", "COMPT1"};
  Table COMPT2{this, "", "COMPT", "COMPT2"};
  Table PARAM{this, "", "PARAM", ""};
  Table MEM04{this, "", "MEM04", ""};
  Table MEM02{this, "", "MEM02", ""};
  Table PIECE{this, "", "PIECE", ""};

  // Fields of the main table
  Champ TYPE{this, "TYPE", table(false)};
  Champ DTOPE{this, "DTOPE", table(false)};
  Champ NUMCP{this, "NUMCP", table(false)};
  Champ NPIEC{this, "NPIEC", table(false)};
  Champ NPIES{this, "NPIES", table(false)};
  Champ IDENT{this, "IDENT", table(false)};
  // PARAM
  Champ PARAM_PNUME{"PNUME", &PARAM};
  Champ PARAM_PRE18{"PRE18", &PARAM};
  Champ PARAM_PDTCL{"PDTCL", &PARAM};
  Champ PARAM_PDFEX{"PDFEX", &PARAM};
  Champ PARAM_PDDEX{"PDDEX", &PARAM};
  Champ PARAM_PXCLO{"PXCLO", &PARAM};
  // MEM02, MEM04
  Champ MEM02_ANMOI{"ANMOI", &MEM02};
  Champ MEM04_ANMOI{"ANMOI", &MEM04};
  Champ MEM04_EXERCICE{"EXERCICE", &MEM04};
  Champ MEM04_MOIAN{"MOIAN", &MEM04};
  // COMPT1
  Champ COMPT1_NATUC{"NATUC", &COMPT1};
  Champ COMPT1_CCTRA{"CCTRA", &COMPT1};
  Champ COMPT1_LIBCP{"LIBCP", &COMPT1};
  Champ COMPT1_NUMCP{"NUMCP", &COMPT1};
  // PIECE
  Champ PIECE_NPIES{"NPIES", &PIECE};
  Champ PIECE_IMPUT{"IMPUT", &PIECE};
  // COMPT2
  Champ COMPT2_NUMCP{"NUMCP", &COMPT2};
  Champ COMPT2_LIBCP{"LIBCP", &COMPT2};

 private:
  // "MESS_OK" of the message module.
  void messageOk(const std::string& text);
  // Leaves the screen at once, without pending messages.
  void quitter(Evt* e);
  // The YYYYMM of DATE_DEBUT_NOUVEL_E.
  std::string anneeMoisNouvelExercice();
  void verifierBorne(Evt* e, Date& date, const char* start, const char* control);
  void ouvrirGestion(const char* mode);
};

class MIRVAEAcces1 : public MIRVAEAcces {
 public:
  explicit MIRVAEAcces1(Evt* e) : MIRVAEAcces(e, registry::operationKind(1)) {}
};

}  // namespace browser
