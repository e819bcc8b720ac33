#include "posting/creer_piece.h"

#include <memory>

namespace posting {

namespace {

constexpr const char* kComposant = "CPPIECE";

Side opposite(Side side) { return side == Side::Debit ? Side::Credit : Side::Debit; }

std::unique_ptr<Evt> vide() { return std::make_unique<EvtParamVal>(new InfoCode(0, 0, 0, 0, 0, 0)); }

}  // namespace

PostingProcess::PostingProcess(Evt* e, const registry::OperationKind& kind) : Traitmnt(e), kind_(kind) {
  nomBase("CP");
  nomLibelles("LIBE1", "LIBEL");
  nomTable("MIRVAE", nullptr);
  lancement()->param(0, P_IDENT, 0);
}

void PostingProcess::registerBranches(const char* counterpart) {
  addBranch("DEBUT", &PostingProcess::debut);
  addBranch("FAIRE", &PostingProcess::faire);
  addBranch("FAIT_IMPORT_PIECE", &PostingProcess::fait_import_piece);
  addBranch("CREER_ENTETE", &PostingProcess::creer_entete);
  addBranch("CREER_LIGNE_HT", &PostingProcess::creer_ligne_ht);
  addBranch("CREER_LIGNE_TVA", &PostingProcess::creer_ligne_tva);
  if (counterpart) {
    addBranch(counterpart, &PostingProcess::creer_ligne_tiers);
    addBranch("CREER_ECHEANCE", &PostingProcess::creer_echeance);
  }
  addBranch("CREER_ANALYTIQUE", &PostingProcess::creer_analytique);
  addBranch("TRAITER_ERREUR", &PostingProcess::traiter_erreur);
}

// ---------------------------------------------------------------------------- cycle

void PostingProcess::debut(Evt* e) {
  if (PARAM.lit(3, PARAM_PNUME, '=', Valeur::entier(1)) != 0) sortir(e, 0);
}

void PostingProcess::faire(Evt* e) {
  if (table(false)->lit(3, MIRVAE_IDENT, '=', P_IDENT) == 0) {
    // The header is read by its identifier alone: another kind's operation would be
    // posted with this kind's sides and accounts.
    if (MIRVAE_TYPE != kind_.type) {
      BoiteMessage("L'opération " + P_IDENT.chaine() + " est de type « " + MIRVAE_TYPE.chaine() +
                       " » : elle ne peut être comptabilisée comme une opération de type « " + kind_.type + " ».",
                   0, nullptr);
      V_FLAG_E = 1;
    } else {
      procedure("FAIT_IMPORT_PIECE");
      afterPiece();
    }
  }
  sortir(e, 0);
}

void PostingProcess::fait_import_piece(Evt*) {
  V_FLAG_E = 0;
  EvtParamRef instance(1, &V_INSTANCE);
  appelerProcedure("*", kComposant, "INTERFACE", "DEBUT_IMPORT", &instance, -1);
  if (erreurMethode() != 0) {
    BoiteMessage("La connexion à la comptabilité est impossible !", 0, nullptr);
    V_FLAG_E = 1;
    return;
  }

  procedure("CREER_ENTETE");
  EvtParamRef npies(1, &V_NPIES);
  if (!importer("DEBUT_PIECE", &npies)) return;
  // The operation points to its new piece from now on, whatever follows.
  MIRVAE_NPIES = V_NPIES;
  table(false)->ecrit();

  envoyerLignes();
  if (!sendCounterpart()) return;

  Chaine valider("O");
  EvtParamRef fin(1, &valider);
  if (!importer("FIN_PIECE", &fin)) return;
  PIECE_IMM.raz('N');
  MOUVE_IMM.raz('N');
  ECHEA_IMM.raz('N');

  if (!importer("FIN_IMPORT")) return;
  viderTransfert(PIECE_IMM, PIECE_IMM_NINST);
  viderTransfert(MOUVE_IMM, MOUVE_IMM_NINST);
  viderTransfert(ECHEA_IMM, ECHEA_IMM_NINST);
}

// The lines of the operation, in key order. A failure ends the lines; the caller
// goes on with the counterpart.
void PostingProcess::envoyerLignes() {
  MIRVAL.initRequete();
  MIRVAL.ajouteFiltre(MIRVAL_NUMERO, '/', MIRVAE_IDENT + "|");
  MIRVAL.activeRequete();
  for (int rc = MIRVAL.suivant(3); rc == 0; rc = MIRVAL.suivant(1))
    if (!sendLine()) return;
}

bool PostingProcess::sendLine() {
  // A line without an excluding-tax amount makes no movement at all, VAT included.
  if (MIRVAL_HT.decimal().isZero()) return true;
  lireCompte(MIRVAL_NUMCP);
  if (!sendExcludingTaxMovement()) return false;
  return MIRVAL_TVA.decimal().isZero() || sendVatOfCode();
}

bool PostingProcess::sendCounterpart() {
  lireCompte(MIRVAE_NUMCP);
  procedure("CREER_LIGNE_TIERS");
  if (!importer("DEBUT_LIGNE")) return false;
  procedure("CREER_ECHEANCE");
  if (!importer("ECHEANCE")) return false;
  if (!importer("FIN_LIGNE")) return false;
  MOUVE_IMM.raz('N');
  viderTransfert(ECHEA_IMM, ECHEA_IMM_NINST);
  return true;
}

bool PostingProcess::sendExcludingTaxMovement() {
  procedure("CREER_LIGNE_HT");
  EvtParamRef uniq(1, &V_MOUVE_UNIQ);
  if (!importer("DEBUT_LIGNE", &uniq)) return false;
  MIRVAL_MOUVE_UNIQ = V_MOUVE_UNIQ;
  MIRVAL.ecrit();
  envoyerAnalytique();
  if (!importer("FIN_LIGNE")) return false;
  MOUVE_IMM.raz('N');
  return true;
}

bool PostingProcess::sendVatOfCode() {
  lireCompte(MIRVAL_NUMCP);
  if (CDTVA.lit(3, CDTVA_COTVA, '=', MIRVAL_COTVA) != 0) CDTVA.raz();
  V_NUMCP = vatAccount();
  return sendVatMovement();
}

bool PostingProcess::sendVatMovement() {
  procedure("CREER_LIGNE_TVA");
  if (!importer("DEBUT_LIGNE")) return false;
  if (!importer("FIN_LIGNE")) return false;
  MOUVE_IMM.raz('N');
  return true;
}

Valeur PostingProcess::salesVatAccount(VatBasis otherwise) {
  VatBasis owed = otherwise;
  for (const Donnee* said : {static_cast<const Donnee*>(&PARAM_PMTVA), static_cast<const Donnee*>(&COMPT_TPTVA)}) {
    if (*said == "E" || *said == "D") {
      owed = *said == "E" ? VatBasis::Receipts : VatBasis::Debits;
      break;
    }
  }
  return owed == VatBasis::Receipts ? CDTVA_CETVA.valeur() : CDTVA_CITVA.valeur();
}

// The analytic rows of the current line; a failure ends them, not the line.
void PostingProcess::envoyerAnalytique() {
  MIRVAANA.initRequete();
  MIRVAANA.ajouteFiltre(MIRVAANA_NUMERO, '/', MIRVAL_IDENT + "|");
  MIRVAANA.activeRequete();
  for (int rc = MIRVAANA.suivant(3); rc == 0; rc = MIRVAANA.suivant(1)) {
    procedure("CREER_ANALYTIQUE");
    if (!importer("ANALYTIQUE")) return;
  }
}

// ---------------------------------------------------------------------------- transfer rows

void PostingProcess::creer_entete(Evt*) {
  nouvelleLigne(PIECE_IMM, PIECE_IMM_NINST);
  PIECE_IMM_NUMJL = MIRVAE_NUMJL;
  PIECE_IMM_DTOPE = MIRVAE_DTOPE;
  PIECE_IMM_NSAIS = "";
  PIECE_IMM_NPIEC = MIRVAE_NPIEC;
  PIECE_IMM_INPIE = MIRVAE_INPIE;
  PIECE_IMM_MONNAIE_IDENT = MIRVAE_MONNAIE_IDENT;
  PIECE_IMM_COURS = MIRVAE_COURS;
  PIECE_IMM_CORIG = "*COMPTA*";
  PIECE_IMM.ecrit();
}

void PostingProcess::creer_ligne_ht(Evt*) {
  nouvelleLigne(MOUVE_IMM, MOUVE_IMM_NINST);
  MOUVE_IMM_NUMCP = MIRVAL_NUMCP;
  MOUVE_IMM_LIBEC = MIRVAE_INPIE;
  poser(MIRVAL_HT.decimal(), lineSide());
  MOUVE_IMM_COTVA = MIRVAL_COTVA;
  MOUVE_IMM_CPOST = MIRVAL_CPOST;
  MOUVE_IMM_CCRIT = MIRVAL_CCRIT;
  MOUVE_IMM.ecrit();
}

void PostingProcess::creer_ligne_tva(Evt*) {
  nouvelleLigne(MOUVE_IMM, MOUVE_IMM_NINST);
  MOUVE_IMM_NUMCP = V_NUMCP;
  MOUVE_IMM_LIBEC = MIRVAE_INPIE;
  poser(MIRVAL_TVA.decimal(), lineSide());
  MOUVE_IMM.ecrit();
}

void PostingProcess::creer_ligne_tiers(Evt*) {
  nouvelleLigne(MOUVE_IMM, MOUVE_IMM_NINST);
  MOUVE_IMM_NUMCP = MIRVAE_NUMCP;
  MOUVE_IMM_LIBEC = MIRVAE_INPIE;
  poser(MIRVAE_TTC.decimal(), opposite(lineSide()));
  MOUVE_IMM.ecrit();
}

// The due date of the counterpart, with the terms of its account read just before.
void PostingProcess::creer_echeance(Evt*) {
  nouvelleLigne(ECHEA_IMM, ECHEA_IMM_NINST);
  ECHEA_IMM_DTECH = MIRVAE_DTECH;
  ECHEA_IMM_CTYPR = COMPT_CTYPR;
  ECHEA_IMM_NJLTR = COMPT_JLTRT;
  ECHEA_IMM_CTYEC = COMPT_CTYEC;
  ECHEA_IMM_MTECH = MIRVAE_TTC.decimal().abs();
  ECHEA_IMM_BPECH = COMPT_RGPAY;
  ECHEA_IMM.ecrit();
}

void PostingProcess::creer_analytique(Evt*) {
  nouvelleLigne(VTSEC_IMM, VTSEC_IMM_NINST);
  VTSEC_IMM_CSECT = MIRVAANA_CSECT;
  VTSEC_IMM_MTADE = MIRVAANA_MTADE;
  VTSEC_IMM_MTACR = MIRVAANA_MTACR;
  VTSEC_IMM.ecrit();
}

// ---------------------------------------------------------------------------- errors

// Parameters: the component, the procedure that failed, its code. Only code 10
// carries texts; each gives one message box, in the component's order.
void PostingProcess::traiter_erreur(Evt* e) {
  Chaine VCOMPOSANT("VCOMPOSANT", "", "", 4, this);
  Chaine VMETHODE("VMETHODE", "", "", 4, this);
  Entier VERREUR("VERREUR", "", "", 4, this);
  Chaine VTEXTE("VTEXTE", "", "", 4, this);
  e->param(0, VCOMPOSANT, 0);
  e->param(1, VMETHODE, 0);
  e->param(2, VERREUR, 0);
  VTEXTE = "*";
  if (!(VERREUR == 10)) return;

  std::string composant = VCOMPOSANT.chaine();
  EvtParamRef debut(1, &V_INSTANCE);
  appelerProcedure("*", composant.c_str(), "INTERFACE", "POSDEBUT_ERREUR", &debut, -1);
  while (!VTEXTE.estVide()) {
    VTEXTE = "";
    EvtParamRef suivante(3, &VERREUR, &VTEXTE, &V_INSTANCE);
    appelerProcedure("*", composant.c_str(), "INTERFACE", "ERREUR_SUIVANTE", &suivante, -1);
    if (!VTEXTE.estVide()) BoiteMessage("Erreur lors validation de la pièce :@" + VTEXTE, 0, nullptr);
  }
}

// ---------------------------------------------------------------------------- helpers

void PostingProcess::procedure(const char* name) { appelerProcedure("", "", "", name, vide().get(), 0); }

bool PostingProcess::importer(const char* name, Evt* params) {
  std::unique_ptr<Evt> empty;
  if (!params) {
    empty = vide();
    params = empty.get();
  }
  appelerProcedure("*", kComposant, "INTERFACE", name, params, -1);
  int code = erreurMethode();
  if (code == 0) return true;
  Chaine composant(kComposant), methode(name);
  Entier erreur(code);
  EvtParamRef failure(3, &composant, &methode, &erreur);
  appelerProcedure("", "", "", "TRAITER_ERREUR", &failure, 0);
  V_FLAG_E = 1;
  return false;
}

void PostingProcess::lireCompte(const Donnee& numcp) {
  if (COMPT.lit(3, COMPT_NUMCP, '=', numcp) != 0) COMPT.raz();
}

void PostingProcess::nouvelleLigne(Table& table, Champ& ninst) {
  table.raz('N');
  table.raz();
  ninst = V_INSTANCE;
}

void PostingProcess::viderTransfert(Table& table, Champ& ninst) {
  table.initRequete();
  table.ajouteFiltre(ninst, '=', V_INSTANCE);
  table.vide();
}

void PostingProcess::poser(const Decimal& amount, Side side) {
  if (amount.sign() < 0) side = opposite(side);
  (side == Side::Debit ? MOUVE_IMM_MTDEB : MOUVE_IMM_MTCRE) = amount.abs();
}

}  // namespace posting
