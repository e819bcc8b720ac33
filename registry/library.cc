#include "registry/library.h"

#include "access/acces.h"
#include "analytic/gest_ana.h"
#include "entry/gestion1.h"
#include "entry/gestion2.h"
#include "entry/gestion3.h"
#include "entry/gestion4.h"
#include "entry/gestion6.h"
#include "host/registry.h"
#include "justification/gest_jus.h"
#include "host/value.h"
#include "posting/creer_piece_bq.h"
#include "posting/creer_piece_fc.h"
#include "posting/creer_piece_ff.h"
#include "posting/creer_piece_od.h"
#include "posting/supprimer_piece.h"
#include "posting/verifier_modif_piece.h"
#include "printing/impr.h"
#include "printing/interface.h"
#include "printing/layouts.h"

namespace registry {

using host::Global;
using host::Module;
using host::Source;

namespace {

void declarerUnites() {
  // Units are added here in load order as their modules are built.

  // Unit ACCES1.
  static const Global acces1Global("MIRVAE", "MIRVAE");
  static const Module acces1("", "MIRVAE-ACCES1", &host::fabriquer<browser::MIRVAEAcces1>, false, "");
  static const Source acces1Source("MIRVAE", nullptr);

  // Unit ACCES2.
  static const Global acces2Global("MIRVAE", "MIRVAE");
  static const Module acces2("", "MIRVAE-ACCES2", &host::fabriquer<browser::MIRVAEAcces2>, false, "");
  static const Source acces2Source("MIRVAE", nullptr);

  // Unit ACCES3.
  static const Global acces3Global("MIRVAE", "MIRVAE");
  static const Module acces3("", "MIRVAE-ACCES3", &host::fabriquer<browser::MIRVAEAcces3>, false, "");
  static const Source acces3Source("MIRVAE", nullptr);

  // Unit ACCES4.
  static const Global acces4Global("MIRVAE", "MIRVAE");
  static const Module acces4("", "MIRVAE-ACCES4", &host::fabriquer<browser::MIRVAEAcces4>, false, "");
  static const Source acces4Source("MIRVAE", nullptr);

  // Unit ACCES5.
  static const Global acces5Global("MIRVAE", "MIRVAE");
  static const Module acces5("", "MIRVAE-ACCES5", &host::fabriquer<browser::MIRVAEAcces5>, false, "");
  static const Source acces5Source("MIRVAE", nullptr);

  // Unit ACCES6.
  static const Global acces6Global("MIRVAE", "MIRVAE");
  static const Module acces6("", "MIRVAE-ACCES6", &host::fabriquer<browser::MIRVAEAcces6>, false, "");
  static const Source acces6Source("MIRVAE", nullptr);

  // Unit CREER_PIECE_FC, GESTION1, SUPPRIMER_PIECE, VERIFIER_MODIF_PIECE.
  static const Global postingGlobal("MIRVAE", "MIRVAE");
  static const Module creerPieceFc("", "MIRVAE-CREER_PIECE_FC", &host::fabriquer<MIRVAECreer_piece_fc>, false, "");
  static const Module gestion1("", "MIRVAE-GESTION1", &host::fabriquer<MIRVAEGestion1>, false, "");
  static const Module supprimerPiece("", "MIRVAE-SUPPRIMER_PIECE", &host::fabriquer<MIRVAESupprimer_piece>, false, "");
  static const Module verifierModifPiece("", "MIRVAE-VERIFIER_MODIF_PIECE",
                                         &host::fabriquer<MIRVAEVerifier_modif_piece>, false, "");
  static const Source postingSource("MIRVAE", nullptr);

  // Unit CREER_PIECE_FF, GESTION2.
  static const Global creerPieceFfGlobal("MIRVAE", "MIRVAE");
  static const Module creerPieceFf("", "MIRVAE-CREER_PIECE_FF", &host::fabriquer<MIRVAECreer_piece_ff>, false, "");
  static const Module gestion2("", "MIRVAE-GESTION2", &host::fabriquer<MIRVAEGestion2>, false, "");
  static const Source creerPieceFfSource("MIRVAE", nullptr);

  // Unit CREER_PIECE_NDF, GESTION3.
  static const Global creerPieceNdfGlobal("MIRVAE", "MIRVAE");
  static const Module creerPieceNdf("", "MIRVAE-CREER_PIECE_NDF", &host::fabriquer<MIRVAECreer_piece_ndf>, false, "");
  static const Module gestion3("", "MIRVAE-GESTION3", &host::fabriquer<MIRVAEGestion3>, false, "");
  static const Source creerPieceNdfSource("MIRVAE", nullptr);

  // Unit CREER_PIECE_BQ, GESTION4.
  static const Global creerPieceBqGlobal("MIRVAE", "MIRVAE");
  static const Module creerPieceBq("", "MIRVAE-CREER_PIECE_BQ", &host::fabriquer<MIRVAECreer_piece_bq>, false, "");
  static const Module gestion4("", "MIRVAE-GESTION4", &host::fabriquer<MIRVAEGestion4>, false, "");
  static const Source creerPieceBqSource("MIRVAE", nullptr);

  // Unit CREER_PIECE_CA, GESTION5.
  static const Global creerPieceCaGlobal("MIRVAE", "MIRVAE");
  static const Module creerPieceCa("", "MIRVAE-CREER_PIECE_CA", &host::fabriquer<MIRVAECreer_piece_ca>, false, "");
  static const Module gestion5("", "MIRVAE-GESTION5", &host::fabriquer<MIRVAEGestion5>, false, "");
  static const Source creerPieceCaSource("MIRVAE", nullptr);

  // Unit CREER_PIECE_OD, GESTION6.
  static const Global creerPieceOdGlobal("MIRVAE", "MIRVAE");
  static const Module creerPieceOd("", "MIRVAE-CREER_PIECE_OD", &host::fabriquer<MIRVAECreer_piece_od>, false, "");
  static const Module gestion6("", "MIRVAE-GESTION6", &host::fabriquer<MIRVAEGestion6>, false, "");
  static const Source creerPieceOdSource("MIRVAE", nullptr);

  // Unit GEST_ANA.
  static const Global gestAnaGlobal("MIRVAE", "MIRVAE");
  static const Module gestAna("", "MIRVAE-GEST_ANA", &host::fabriquer<analytic::MIRVAEGest_ana>, false, "");
  static const Source gestAnaSource("MIRVAE", nullptr);

  // Unit GEST_JUS: it declares no globals of its own.
  static const Module gestJus("Justification Règlement", "MIRVAE-GEST_JUS",
                              &host::fabriquer<justification::MIRVAEGest_jus>, false, "");
  static const Source gestJusSource("MIRVAE", nullptr);
  // Unit IMPR: the form prints, then the list prints.
  static const Global imprGlobal("MIRVAE", "MIRVAE");
  static const Module imprFiche1("", "MIRVAE-IMPR_FICHE1", &host::fabriquer<printing::MIRVAEImpr_fiche1>, false, "");
  static const Module imprFiche2("", "MIRVAE-IMPR_FICHE2", &host::fabriquer<printing::MIRVAEImpr_fiche2>, false, "");
  static const Module imprFiche3("", "MIRVAE-IMPR_FICHE3", &host::fabriquer<printing::MIRVAEImpr_fiche3>, false, "");
  static const Module imprFiche4("", "MIRVAE-IMPR_FICHE4", &host::fabriquer<printing::MIRVAEImpr_fiche4>, false, "");
  static const Module imprFiche5("", "MIRVAE-IMPR_FICHE5", &host::fabriquer<printing::MIRVAEImpr_fiche5>, false, "");
  static const Module imprFiche6("", "MIRVAE-IMPR_FICHE6", &host::fabriquer<printing::MIRVAEImpr_fiche6>, false, "");
  static const Module imprListe1("", "MIRVAE-IMPR_LISTE1", &host::fabriquer<printing::MIRVAEImpr_liste1>, false, "");
  static const Module imprListe2("", "MIRVAE-IMPR_LISTE2", &host::fabriquer<printing::MIRVAEImpr_liste2>, false, "");
  static const Module imprListe3("", "MIRVAE-IMPR_LISTE3", &host::fabriquer<printing::MIRVAEImpr_liste3>, false, "");
  static const Module imprListe4("", "MIRVAE-IMPR_LISTE4", &host::fabriquer<printing::MIRVAEImpr_liste4>, false, "");
  static const Module imprListe5("", "MIRVAE-IMPR_LISTE5", &host::fabriquer<printing::MIRVAEImpr_liste5>, false, "");
  static const Module imprListe6("", "MIRVAE-IMPR_LISTE6", &host::fabriquer<printing::MIRVAEImpr_liste6>, false, "");
  static const Source imprSource("MIRVAE", nullptr);

  // Unit INTERFACE: it also works with the globals of the general-ledger library.
  static const Global interfaceComptaGlobal("COMPTA", "MIRVAE");
  static const Global interfaceGlobal("MIRVAE", "MIRVAE");
  static const Module interface("", "MIRVAE-INTERFACE", &host::fabriquer<printing::MIRVAEInterface>, false, "");
  static const Source interfaceSource("MIRVAE", nullptr);
}

}  // namespace

void chargerBibliotheque() {
  static bool loaded = false;
  if (loaded) return;
  loaded = true;
  // The crash flag of the access screens' model; the library itself never reads it.
  [[maybe_unused]] static host::Chaine crashFlag("$$|VCODECRASHFLAG", "", "", 2, "CRASHFLAG", nullptr);
  declarerUnites();
  // The layouts of its prints, which the printer looks up by print job.
  printing::registerLayouts();
}

}  // namespace registry
