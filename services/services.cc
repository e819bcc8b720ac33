#include "services/services.h"

#include "host/registry.h"
#include "services/analytics.h"
#include "services/compta.h"
#include "services/cpcdtva.h"
#include "services/cpcompt.h"
#include "services/cppiece.h"
#include "services/cpparam.h"
#include "services/messages.h"
#include "services/monnaie.h"
#include "services/sysascii.h"
#include "services/zefmds.h"
#include "services/zefndoc.h"

namespace services {

using host::fabriquer;
using host::Module;

void chargerServices() {
  static bool loaded = false;
  if (loaded) return;
  loaded = true;
  Module("", "CPMESSAG-INTERFACE", &fabriquer<Cpmessag>, false, "");
  Module("", "COMPTA-MOD_CAL_BIBLIOPROC", &fabriquer<Compta>, false, "");
  Module("", "MIRVAE-MOD_CAL_BIBLIOPROC", &fabriquer<MirvaeBiblioproc>, false, "");
  Module("", "COMPTA-VISUECRI", &fabriquer<Visuecri>, false, "");
  Module("", "COMPTA-LANCE_REOUVERTURE_ANNU", &fabriquer<Lance_reouverture_annu>, false, "");
  Module("", "COMPTA-CHOIX_MODELE_ECRITURES", &fabriquer<Choix_modele_ecritures>, false, "");
  Module("", "COMPTA-CHOIX_TABLE_TYPFR", &fabriquer<Choix_table_typfr>, false, "");
  Module("", "COMPTA-CHOIX_TABLE_TYPLB", &fabriquer<Choix_table_typlb>, false, "");
  Module("", "CPCOMPT-INTERFACE", &fabriquer<Cpcompt>, false, "");
  Module("", "CPCDTVA-INTERFACE", &fabriquer<Cpcdtva>, false, "");
  Module("", "CPPARAM-INTERFACE", &fabriquer<Cpparam>, false, "");
  Module("", "CPPOANA-INTERFACE", &fabriquer<Cppoana>, false, "");
  Module("", "CPCRITA-INTERFACE", &fabriquer<Cpcrita>, false, "");
  Module("", "CPSECAN-INTERFACE", &fabriquer<Cpsecan>, false, "");
  Module("", "MONNAIE-INTERFACE", &fabriquer<Monnaie>, false, "");
  Module("", "ZEFNDOC-INTERFACE", &fabriquer<Zefndoc>, false, "");
  Module("", "ZEFMDS-NETTOYAGE_PARAMLST1_LISTE", &fabriquer<Nettoyage_paramlst1_liste>, false, "");
  Module("", "SYSASCII-INTERFACE", &fabriquer<Sysascii>, false, "");
  chargerGrandLivre();
}

}  // namespace services
