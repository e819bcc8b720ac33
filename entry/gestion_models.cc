// Prefilling a new operation: from an entry model of the accounting application
// (MODTE, MODLI) chosen by its code, or from the operation being duplicated, whose
// lines and analytic rows are copied at the new rate.
#include "entry/gestion.h"

#include "host/currency.h"
#include "host/text.h"
#include "model/child_rows.h"

namespace entry {

namespace {

// Model lines belong to their model through NLIGNE: the code padded with blanks to
// 11 characters, then the line's number.
constexpr std::size_t kModelCodeWidth = 11;

// The model lines that this screen does not create: the counterpart and the VAT,
// which the posting makes itself.
bool madeByPosting(const Donnee& account) { return account == "C" || account == "T"; }

}  // namespace

bool EntryScreen::readAccountOfNature(Table& t, Champ& numcp, Champ& natuc, Champ& cctra, const std::string& account,
                                      const char* nature) {
  t.initRequete();
  if (nature && *nature) t.ajouteFiltre(natuc, '?', nature);
  t.ajouteFiltre(cctra, '#', "O");
  t.ajouteFiltre(numcp, '=', account);
  t.choisitIndex("NUMCP");
  t.activeRequete();
  bool found = t.suivant(3) == 0;
  if (!found) t.raz();
  t.initRequete();
  return found;
}

// ---------------------------------------------------------------------------- entry models

void EntryScreen::v_cmodel_choisir(Evt*) { procedure("MODTE_CHOISIR"); }

void EntryScreen::modte_choisir(Evt*) {
  Entier V_CHOIX_MODELE("V_CHOIX_MODELE", "Rend le choix effectué dans l'objet Choix du modèle", "", 4, this);
  Chaine dossier(Univers::dossier());
  lireJournal();
  EvtParamRef choix(4, &V_CHOIX_MODELE, &V_CMODEL, &dossier, &JONAL_NUMJL);
  appelerModule("", "COMPTA", "CHOIX_MODELE_ECRITURES", &choix);
  ecran()->affiche("V_CMODEL", "");
  enFile("V_CMODEL");
}

void EntryScreen::v_cmodel(Evt* e) {
  if (V_CMODEL.estVide()) return;
  if (MODTE.lit(3, MODTE_CODE, '=', V_CMODEL) != 0) return refuser(e, libelle("0415"), "V_CMODEL");
  if (MODTE_NUMJL != MIRVAE_NUMJL)
    return refuser(e, "Le modèle doit être associé au n° journal <" + MIRVAE_NUMJL.chaine() + "> !", "V_CMODEL");
  procedure("MODTE_GENERER");
}

void EntryScreen::modte_generer(Evt*) {
  // A new creation that keeps the model of the previous one comes here without
  // "V_CMODEL": the model is read again rather than trusted to be in the buffer.
  if (V_CMODEL.estVide() || MODTE.lit(3, MODTE_CODE, '=', V_CMODEL) != 0) return;

  enFile("APRES_ABANDON_LIGNE");
  MEM_MIRVAL.initRequete();
  MEM_MIRVAL.vide();

  if (!MODTE_NPIEC.estVide()) MIRVAE_NPIEC = MODTE_NPIEC;
  MIRVAE_INPIE = MODTE_INPIE;

  std::string code = V_CMODEL.chaine();
  code.resize(kModelCodeWidth, ' ');
  MODLI.initRequete();
  MODLI.ajouteFiltre(MODLI_NLIGNE, '/', code);
  MODLI.choisitIndex("NLIGNE");
  MODLI.activeRequete();
  for (int rc = MODLI.suivant(3); rc == 0; rc = MODLI.suivant(1)) {
    if (madeByPosting(MODLI_COL_NUMCP)) continue;
    // A read by key ignores a binding's request: whether the account is one the
    // header or the lines may take is asked of the dossier with the lists' filters.
    if (*kind_.headerNature && readAccountOfNature(COMPT1, COMPT1_NUMCP, COMPT1_NATUC, COMPT1_CCTRA,
                                                  MODLI_COL_NUMCP.chaine(), kind_.headerNature)) {
      MIRVAE_NUMCP = COMPT1_NUMCP;
      VLIBCP1 = COMPT1_LIBCP;
      continue;
    }
    // An account root takes the first account that begins with it.
    COMPT.initRequete();
    COMPT.ajouteFiltre(COMPT_NUMCP, '/', MODLI_COL_NUMCP);
    COMPT.choisitIndex("NUMCP");
    COMPT.activeRequete();
    bool found = COMPT.suivant(3) == 0;
    COMPT.initRequete();
    if (!found) continue;
    if (!readAccountOfNature(COMPT2, COMPT2_NUMCP, COMPT2_NATUC, COMPT2_CCTRA, COMPT_NUMCP.chaine(), kind_.lineNature))
      continue;
    addModelLine();
  }
  MODLI.initRequete();

  procedure("RENUMEROTE_LIGNES");
  // The lines replaced carried amounts: the totals must not keep them.
  procedure("CALCUL_TOTAUX");
  ecran()->affiche("GRP1", "LST", "");
  ecran()->fonction(16, "LST");
}

// A line of the model on the account in COMPT2. Amounts stay empty: the user types them.
void EntryScreen::addModelLine() {
  MIRVAL.raz();
  nouvelIdentifiant("MIRVAL", MIRVAL_IDENT);
  MIRVAL_NUMERO = MIRVAE_IDENT.chaine() + "|";
  MIRVAL_NUMCP = COMPT2_NUMCP;
  MIRVAL_LIBEC = MODLI_COL_LIBEC.estVide() ? MIRVAE_INPIE.chaine() : MODLI_COL_LIBEC.chaine();
  // As for a typed line: no VAT code or rate when the dossier does not manage VAT.
  if (TVA_GR_ACTIF == 0) {
    MIRVAL_COTVA = "";
    MIRVAL_TXTVA = 0;
  } else {
    MIRVAL_COTVA = MODLI_COL_COTVA.estVide() ? COMPT2_COTVA.chaine() : MODLI_COL_COTVA.chaine();
    lireOuVider(CDTVA, CDTVA_COTVA, MIRVAL_COTVA);
    EvtParamRef taux(3, &CDTVA_COTVA, &MIRVAE_DTOPE, &VTXTVA);
    compta("LECTURE_HISTO_TXTVA", &taux);
    MIRVAL_TXTVA = VTXTVA.decimal();
  }
  MIRVAL_CPOST = COMPT2_CPOST;
  MIRVAL_CCRIT = COMPT2_CCRIT;
  procedure("AJOUTER_LIGNE");
}

// ---------------------------------------------------------------------------- import of a duplicated operation

void EntryScreen::importation_lignes(Evt*) {
  procedure("INCREMENTE_NUMERO_PIECE");
  if (!MIRVAE_NPIEC.estVide() && MIRVAE_INPIE.position(host::text::kPiecePlaceholder) > 0) remplacerPieceDansLibelle();
  ecran()->affiche("NPIEC", "INPIE", "");

  Devises& devises = euro();
  MIRVAE_MONNAIE_IDENT = MONNAIE_ORIGINE;
  devises.definirCourante(MIRVAE_MONNAIE_IDENT.chaine(), MIRVAE_DTOPE.jour());
  MIRVAE_COURS = devises.coursCourant();

  // Every amount is scaled by the source's rate over the copy's, rounded to the
  // currency's decimals, and TTC stays HT + TVA, so that the copy posts as
  // exactly as a typed piece.
  std::string currency = MIRVAE_MONNAIE_IDENT.chaine();
  Decimal newRate = MIRVAE_COURS.decimal(), oldRate = COURS_ORIGINE.decimal();
  // A source saved without its rate keeps its amounts rather than losing them.
  if (oldRate.sign() <= 0) oldRate = newRate;
  auto atNewRate = [&](const Donnee& amount) { return devises.reprice(amount.decimal(), newRate, oldRate, currency); };

  MIRVAL2.initRequete();
  MIRVAL2.ajouteFiltre(MIRVAL2_NUMERO, '/', IDENT_ORIGINE.chaine() + "|");
  MIRVAL2.choisitIndex("NUMERO");
  MIRVAL2.activeRequete();
  for (int rc = MIRVAL2.suivant(3); rc == 0; rc = MIRVAL2.suivant(1)) {
    MIRVAL.raz();
    MIRVAL.copier(MIRVAL2);
    nouvelIdentifiant("MIRVAL", MIRVAL_IDENT);
    MIRVAL_NUMERO = MIRVAE_IDENT.chaine() + "|";
    // The copy has not been posted.
    MIRVAL.affecter("MOUVE_UNIQ", Valeur::entier(0));
    MIRVAL_HT = atNewRate(MIRVAL2_HT);
    MIRVAL_TVA = atNewRate(MIRVAL2_TVA);
    MIRVAL_TTC = MIRVAL_HT.decimal() + MIRVAL_TVA.decimal();
    procedure("AJOUTER_LIGNE");
    copyAnalyticRows(MIRVAL2_IDENT.chaine(), atNewRate);
  }
  MIRVAL2.initRequete();
  MIRVAL.raz();

  procedure("RENUMEROTE_LIGNES");
  ecran()->affiche("LST", "");
  procedure("CALCUL_TOTAUX");
  switchCurrency("DB");
}

// The analytic rows of source line `source` for the new line in MIRVAL. When the
// source rows made up the source line's amount, the copy's rows make up the copy's:
// the rounding left over goes to the last row.
void EntryScreen::copyAnalyticRows(const std::string& source,
                                   const std::function<Decimal(const Donnee&)>& atNewRate) {
  Decimal sourceNet, net;
  std::string last;
  model::copyChildRows(MIRVAANA2, MIRVAANA2_NUMERO, MIRVAANA_M01, source, [&] {
    nouvelIdentifiant("MIRVAANA", MIRVAANA_M01_IDENT);
    MIRVAANA_M01_NUMERO = MIRVAL_IDENT.chaine() + "|";
    MIRVAANA_M01_MTADE = atNewRate(MIRVAANA2_MTADE);
    MIRVAANA_M01_MTACR = atNewRate(MIRVAANA2_MTACR);
    sourceNet += MIRVAANA2_MTACR.decimal() - MIRVAANA2_MTADE.decimal();
    net += MIRVAANA_M01_MTACR.decimal() - MIRVAANA_M01_MTADE.decimal();
    last = MIRVAANA_M01_IDENT.chaine();
  });
  Decimal gap = MIRVAL_HT.decimal() - net;
  if (last.empty() || sourceNet != MIRVAL2_HT.decimal() || gap.isZero()) return;
  if (MIRVAANA_M01.lit(3, MIRVAANA_M01_IDENT, '=', last) != 0) return;
  if (MIRVAANA_M01_MTADE.decimal().isZero())
    MIRVAANA_M01_MTACR = MIRVAANA_M01_MTACR.decimal() + gap;
  else
    MIRVAANA_M01_MTADE = MIRVAANA_M01_MTADE.decimal() - gap;
  MIRVAANA_M01.ecrit();
}

}  // namespace entry
