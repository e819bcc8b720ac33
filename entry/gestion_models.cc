// Prefilling a new operation: from an entry model of the accounting application
// (MODTE, MODLI) chosen by its code, or from the operation being duplicated, whose
// lines and analytic rows are copied at the new rate.
#include "entry/parts.h"

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

EntryModels::EntryModels(EntryScreen& screen, bool offeredOnCreation)
    : Part(screen), offered_on_creation_(offeredOnCreation) {}

void EntryModels::provide(Handlers& handlers) {
  handlers.add("V_CMODEL", this, &EntryModels::v_cmodel);
  handlers.add("V_CMODEL_CHOISIR", this, &EntryModels::v_cmodel_choisir);
  handlers.add("MODTE_CHOISIR", this, &EntryModels::modte_choisir);
  handlers.add("MODTE_GENERER", this, &EntryModels::modte_generer);
}

void EntryModels::creationStarted() {
  if (offered_on_creation_) s_.ecran()->autorise("V_CMODEL", "MODTE_CHOISIR", "");
}

void EntryModels::creationShown() {
  if (!V_CMODEL.estVide()) s_.procedure("MODTE_GENERER");
}

void EntryModels::modificationStarted() {
  V_CMODEL = "";
  s_.ecran()->interdit("V_CMODEL", "MODTE_CHOISIR", "");
}

// Only a new piece created right after this one keeps its model.
void EntryModels::choiceMade(const std::string& choice) {
  if (choice != "2") V_CMODEL = "";
}

void EntryModels::v_cmodel_choisir(Evt*) { s_.procedure("MODTE_CHOISIR"); }

void EntryModels::modte_choisir(Evt*) {
  Entier V_CHOIX_MODELE("V_CHOIX_MODELE", "Rend le choix effectué dans l'objet Choix du modèle", "", 4, &s_);
  Chaine dossier(Univers::dossier());
  s_.lireJournal();
  EvtParamRef choix(4, &V_CHOIX_MODELE, &V_CMODEL, &dossier, &s_.JONAL_NUMJL);
  s_.appelerModule("", "COMPTA", "CHOIX_MODELE_ECRITURES", &choix);
  s_.ecran()->affiche("V_CMODEL", "");
  s_.enFile("V_CMODEL");
}

void EntryModels::v_cmodel(Evt* e) {
  if (V_CMODEL.estVide()) return;
  if (MODTE.lit(3, MODTE_CODE, '=', V_CMODEL) != 0) return s_.refuser(e, s_.libelle("0415"), "V_CMODEL");
  if (MODTE_NUMJL != s_.MIRVAE_NUMJL)
    return s_.refuser(e, "Le modèle doit être associé au n° journal <" + s_.MIRVAE_NUMJL.chaine() + "> !",
                      "V_CMODEL");
  s_.procedure("MODTE_GENERER");
}

void EntryModels::modte_generer(Evt*) {
  // A new creation that keeps the model of the previous one comes here without
  // "V_CMODEL": the model is read again rather than trusted to be in the buffer.
  if (V_CMODEL.estVide() || MODTE.lit(3, MODTE_CODE, '=', V_CMODEL) != 0) return;

  s_.enFile("APRES_ABANDON_LIGNE");
  s_.MEM_MIRVAL.initRequete();
  s_.MEM_MIRVAL.vide();

  if (!MODTE_NPIEC.estVide()) s_.MIRVAE_NPIEC = MODTE_NPIEC;
  s_.MIRVAE_INPIE = MODTE_INPIE;

  std::string code = V_CMODEL.chaine();
  code.resize(kModelCodeWidth, ' ');
  MODLI.initRequete();
  MODLI.ajouteFiltre(MODLI_NLIGNE, '/', code);
  MODLI.choisitIndex("NLIGNE");
  MODLI.activeRequete();
  for (int rc = MODLI.suivant(3); rc == 0; rc = MODLI.suivant(1)) {
    if (madeByPosting(MODLI_COL_NUMCP)) continue;
    std::string account = MODLI_COL_NUMCP.chaine();
    bool taken = false;
    for (Part* part : s_.parts_) taken = taken || part->takesModelAccount(account);
    if (taken) continue;
    // An account root takes the first account that begins with it.
    Table& compt = s_.COMPT;
    compt.initRequete();
    compt.ajouteFiltre(s_.COMPT_NUMCP, '/', account);
    compt.choisitIndex("NUMCP");
    compt.activeRequete();
    bool found = compt.suivant(3) == 0;
    compt.initRequete();
    if (!found) continue;
    LineAccount& line = s_.line();
    if (!EntryScreen::readAccountOfNature(line.accounts(), line.NUMCP(), line.NATUC(), line.CCTRA(),
                                          s_.COMPT_NUMCP.chaine(), s_.lineNature().c_str()))
      continue;
    addModelLine();
  }
  MODLI.initRequete();

  s_.procedure("RENUMEROTE_LIGNES");
  // The lines replaced carried amounts: the totals must not keep them.
  s_.procedure("CALCUL_TOTAUX");
  s_.ecran()->affiche("GRP1", "LST", "");
  s_.ecran()->fonction(16, "LST");
}

// A line of the model on the account the line account part has just read. Amounts stay empty: the user types them.
void EntryModels::addModelLine() {
  EntryScreen& s = s_;
  s.MIRVAL.raz();
  s.nouvelIdentifiant("MIRVAL", s.MIRVAL_IDENT);
  s.MIRVAL_NUMERO = s.MIRVAE_IDENT.chaine() + "|";
  LineAccount& line = s.line();
  s.MIRVAL_NUMCP = line.NUMCP();
  s.MIRVAL_LIBEC = MODLI_COL_LIBEC.estVide() ? s.MIRVAE_INPIE.chaine() : MODLI_COL_LIBEC.chaine();
  // As for a typed line: no VAT code or rate when the dossier does not manage VAT.
  if (s.TVA_GR_ACTIF == 0) {
    s.MIRVAL_COTVA = "";
    s.MIRVAL_TXTVA = 0;
  } else {
    s.MIRVAL_COTVA = MODLI_COL_COTVA.estVide() ? line.COTVA().chaine() : MODLI_COL_COTVA.chaine();
    EntryScreen::lireOuVider(s.CDTVA, s.CDTVA_COTVA, s.MIRVAL_COTVA);
    EvtParamRef taux(3, &s.CDTVA_COTVA, &s.MIRVAE_DTOPE, &s.VTXTVA);
    s.compta("LECTURE_HISTO_TXTVA", &taux);
    s.MIRVAL_TXTVA = s.VTXTVA.decimal();
  }
  s.MIRVAL_CPOST = line.CPOST();
  s.MIRVAL_CCRIT = line.CCRIT();
  s.completeModelLine(MODLI);
  s.procedure("AJOUTER_LIGNE");
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
