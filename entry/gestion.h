// The entry screen of an operation, shared by the six kinds: a header (MIRVAE) and
// its lines (MIRVAL, entered in the list "LST"), with the amounts and VAT of each
// line, the piece numbering of its journal, the checks before saving, and the
// posting to the ledger after each save.
//
// The screen is a core, which declares and handles what the six kinds share, and
// parts (entry/parts.h) that some kinds have: the header account, the entry models.
// Each registered class ("MIRVAE-GESTION1" ...) names its row of the operation-kind
// table (registry/operation_kinds.h), holds its parts, registers the core's and its
// parts' branches in its own order, and gives the few rules its kind changes.
// The screen's variables, tables and fields are public: the host and the parts
// address them as the screen's own.
//
// What the screen relies on:
//   - the dossier's parameters row (PARAM, PNUME 1), read at start; without it the
//     screen says so and closes;
//   - the accounting library's procedures, by name: "COMPTA"/"MOD_CAL_BIBLIOPROC"
//     (dossier check, options, VAT rate history, piece counters and prefixes, nature
//     labels), "CPMESSAG" (messages and questions), "CPCOMPT", "CPCDTVA", "MONNAIE",
//     "CPPARAM", "ZEFNDOC", "SYSASCII", "ZEFMDS";
//   - the modules "MIRVAE-SUPPRIMER_PIECE", the kind's posting module,
//     "MIRVAE-VERIFIER_MODIF_PIECE" and "MIRVAE-GEST_ANA", run to their end by name.
//
// Amounts are exact decimals. Only the VAT of a line is rounded, to the decimals of
// the operation's currency, to the nearest with ties away from zero; the other
// amount is the typed one plus or minus that VAT, so HT + TVA = TTC on every line.
#pragma once

#include <functional>
#include <map>
#include <span>
#include <string>
#include <string_view>
#include <vector>

#include "registry/operation_kinds.h"
#include "host/table.h"
#include "model/gestion_document.h"

namespace entry {

using namespace host;

class EntryScreen;
class LineAccount;

// The branch table of the client invoice screen, in registration order.
extern const std::vector<std::string_view> kInvoiceBranches;
// `order` without the branches `left`, then `added`.
std::vector<std::string_view> branchesWithout(std::vector<std::string_view> order,
                                              std::span<const std::string_view> left,
                                              std::initializer_list<std::string_view> added = {});

// The handlers a screen's core and parts offer, by branch name.
class Handlers {
 public:
  void add(std::string_view name, Automate::Handler handler);
  // A member of `owner` (the screen or one of its parts).
  template <class T>
  void add(std::string_view name, T* owner, void (T::*member)(Evt*)) {
    add(name, [owner, member](Evt* e) { (owner->*member)(e); });
  }
  // Takes the handler of `name` out; an empty handler when none is offered.
  Automate::Handler take(std::string_view name);
  const std::map<std::string, Automate::Handler, std::less<>>& left() const { return handlers_; }

 private:
  std::map<std::string, Automate::Handler, std::less<>> handlers_;
};

// A part of an entry screen that some kinds have: its declarations (made on the
// screen, after the core's), its handlers, and what it adds at the moments of the
// screen that the core names. A part registers itself with the screen it is made on.
class Part {
 public:
  explicit Part(EntryScreen& screen);
  Part(const Part&) = delete;
  Part& operator=(const Part&) = delete;
  virtual ~Part() = default;

  virtual void provide(Handlers& handlers) = 0;
  // The end of "DEBUT": the dossier's options are known.
  virtual void started() {}
  // A new operation has its defaults ("DEBUT_CREATION"), then is shown ("APRES_DEBUT_CREATION").
  virtual void creationStarted() {}
  virtual void creationShown() {}
  virtual void modificationStarted() {}
  // An operation was read ("DEBUT_FICHE").
  virtual void opened() {}
  // The answer of the validation dialog of a creation.
  virtual void choiceMade(const std::string& /*choice*/) {}
  // The header checks of "CONTROLER_GRP1": false once `e` is refused.
  virtual bool headerAccepted(Evt* /*e*/) { return true; }
  // Opens the choice window of `control` ("CTRL_CHOISIR"): false when not its own.
  virtual bool chooses(const std::string& /*control*/) { return false; }
  // Takes the account of an entry model's line as its own: false when it does not.
  virtual bool takesModelAccount(const std::string& /*account*/) { return false; }
  // The account of the line typed or chosen, before it is checked: false once `e` is refused.
  virtual bool lineAccountAccepted(Evt* /*e*/, const std::string& /*account*/) { return true; }
  // The account of the line was read and the line completed from it.
  virtual void lineAccountRead() {}
  // The checks of the lines as a whole ("CONTROLER_LST"): false once `e` is refused.
  virtual bool linesAccepted(Evt* /*e*/) { return true; }
  // The checks that follow those of the header and the lines at validation: false
  // once `e` is refused.
  virtual bool documentAccepted(Evt* /*e*/) { return true; }
  // The header is about to be saved: the part writes what it totals into it.
  virtual void saving() {}
  // The operation was saved and posted.
  virtual void saved() {}
  // The lines were totalled again: `ttc` is what they come to, taxes included.
  virtual void linesTotalled(const Decimal& /*ttc*/) {}
  // The document moved to another currency: `convert` re-prices an amount of the old
  // one; `line` is each line's IDENT in turn, then "" once for the document's own.
  virtual void amountsConverted(const std::string& /*line*/, const std::function<Decimal(const Decimal&)>& /*convert*/) {}
  // The data steps of one line, after its analytic rows: read from the dossier into
  // the work tables, saved into the dossier, deleted from it.
  virtual void lineExtracted() {}
  virtual void lineSaved() {}
  virtual void lineDeleted() {}

 protected:
  EntryScreen& s_;
};

class EntryScreen : public model::Gestion_document2 {
 public:
  // Declares the variables, tables and fields, reads the launch parameters
  // (identifier, mode string) and configures the document. The branch table is the
  // registered class's.
  EntryScreen(Evt* e, const registry::OperationKind& kind);

  const registry::OperationKind& kind() const { return kind_; }

  // Registers the core's and the parts' handlers in `order`; each offered handler
  // must be named once, and every name must have its handler.
  void registerBranches(const std::vector<std::string_view>& order);
  // The side on which a line's amount stands in the ledger: debit for expenses,
  // credit for revenue. The analytic rows of the line stand on the same side.
  virtual bool lineOnDebit() = 0;
  // The label of a new operation whose journal gives no label prefix.
  virtual std::string defaultLabel() { return kind_.defaultLabel; }
  // Completes a line made from the entry model line in `model` before it is added.
  virtual void completeModelLine(Table& /*model*/) {}
  // The nature letters of a line account ("" any).
  virtual std::string lineNature() { return kind_.lineNature; }
  // The VAT type given to the VAT code choice window.
  virtual std::string vatChoiceType() { return kind_.vatChoiceType; }
  // The core's own handlers.
  virtual void provide(Handlers& handlers);
  // At start, the line accounts and VAT codes the lists offer, by the kind's natures
  // and VAT type. A kind whose natures follow each operation opens none.
  virtual void openLineSelections();

  // ---- start, record, modes (lifecycle)
  void init(Evt* e) override;
  void ctrl_defaut_colonne(Evt* e) override;
  void ctrl_custom_colonne(Evt* e) override;
  void ctrl_cache_colonne(Evt* e) override;
  void avant_debut(Evt* e) override;
  void debut(Evt* e) override;
  void selection_tri(Evt* e) override;
  void commande1(Evt* e);
  void info_fiche(Evt* e);
  void constituer_info_fiche(Evt* e);
  void completer_info_fiche(Evt* e);
  void imprime(Evt* e);
  void impr_fiche(Evt* e);
  void modification(Evt* e) override;
  void creat2(Evt* e);
  void debut_visualisation(Evt* e) override;
  void debut_modification(Evt* e) override;
  void debut_creation(Evt* e) override;
  void apres_debut_creation(Evt* e) override;
  void fin_creation(Evt* e) override;
  void debut_fiche(Evt* e) override;
  void b_valid_doc(Evt* e);
  void valid_doc(Evt* e) override;
  void validation(Evt* e) override;
  void apres_validation(Evt* e) override;
  void avant_suppression(Evt* e) override;
  void b_aband_doc(Evt* e);
  void extraction_donnees(Evt* e) override;
  void extraction_table_mirvaana(Evt* e);
  void suppression_donnees(Evt* e) override;
  void suppression_table_mirvaana(Evt* e);
  void validation_donnees(Evt* e) override;
  void validation_table_mirvaana(Evt* e);
  void dialogue(Evt* e) override;

  // ---- import of a duplicated operation (gestion_models.cc)
  void importation_lignes(Evt* e);

  // ---- header checks (gestion_checks.cc)
  void dtope(Evt* e);
  virtual void controler_compt(Evt* e);
  void p1_sortie(Evt* e);
  void grp1_sortie(Evt* e);
  void controler_p1(Evt* e);
  void controler_grp1(Evt* e);
  void controler_lst(Evt* e);

  // ---- piece numbering (gestion_numbering.cc)
  void npiec_entree(Evt* e);
  void npiec(Evt* e);
  void prefixe_numero_piece(Evt* e);
  void inpie_entree(Evt* e);
  void prefixe_intitule_piece(Evt* e);
  void lst_entree(Evt* e);
  void incremente_numero_piece(Evt* e);

  // ---- lines and amounts (gestion_lines.cc)
  void selection(Evt* e) override;
  void ctrl_debut_ligne(Evt* e) override;
  void debut_creation_ligne(Evt* e) override;
  void gestion_analy_oui_non(Evt* e);
  void v_saisie_compt2_ferme(Evt* e);
  void v_saisie_compt(Evt* e);
  void saisie_mtt(Evt* e);
  void lst_mirval_numcp(Evt* e);
  // The label of the line account typed ("LST_VLIBCP2"), its choice window
  // ("COMPT2_CHOISIR"): the line account part names them.
  void lineAccountLabel(Evt* e);
  void chooseLineAccount(Evt* e);
  void lst_v_ht(Evt* e);
  void lst_mirval_cotva(Evt* e);
  void cdtva_choisir(Evt* e);
  virtual void lst_mirval_tva(Evt* e);
  void calcul_mtt_ligne(Evt* e);
  void calcul_tva_selon_ht(Evt* e);
  void calcul_tva_selon_ttc(Evt* e);
  void calcul_ttc(Evt* e);
  void calcul_ht(Evt* e);
  void validation_ligne(Evt* e) override;
  void apres_validation_ligne(Evt* e) override;
  void apres_suppression_ligne(Evt* e) override;
  void bt_analytique(Evt* e);
  void appel_analytique(Evt* e);
  void maj_lignes_memoire(Evt* e);
  void ctrl_choisir(Evt* e) override;
  void ctrl_ouvre(Evt* e) override;

  // ---- currency (gestion_currency.cc)
  void monnaie_choisir(Evt* e);
  void monnaie_ident(Evt* e);
  void cours(Evt* e);
  void ctrl_basculer(Evt* e) override;
  void ctrl_actualiser_mode(Evt* e) override;
  void ctrl_actualiser_bascule(Evt* e) override;
  void actualiser_info_monetaires(Evt* e);
  void definir_bascule(Evt* e);
  // The currency switch converts the document's lines, and the analytic rows of
  // those lines that wait in the work table to be saved with them.
  void convertAmounts(const std::function<Decimal(const Decimal&)>& convert) override;

  // ---- helpers shared by the handlers
  // Runs one of the screen's own branches at once.
  void procedure(const char* name, Evt* e = nullptr);
  // Hands one of the screen's own branches to the host, to run after this action's handlers.
  void enFile(const char* name);
  // A procedure of the accounting library "COMPTA"/"MOD_CAL_BIBLIOPROC".
  void compta(const char* name, Evt* e);
  void messageOk(const std::string& text);
  // Asks a yes/no question; true for yes.
  bool question(const std::string& text);
  // Shows `message`, puts the focus on `control` ("" for the document as a whole),
  // refuses the event and leaves the method result at 1.
  void refuser(Evt* e, const std::string& message, const char* control);
  bool enCreation() const { return modeCourant() == "C"; }
  bool enVisualisation() const { return modeCourant() == "V"; }
  // Fills `target` with a text of a table of standard texts (`table`: `code`, `label`)
  // chosen in the window of the accounting module `module`: the chosen label, or empty
  // when the user asked for none. False, with nothing done, in consultation.
  bool chooseStandardText(const char* module, Table& table, Champ& code, Champ& label, Donnee& target);
  // Reads `t` where `field` = `value`; blanks its record when there is none.
  static bool lireOuVider(Table& t, Champ& field, const Donnee& value);
  // The operation's journal into JONAL (blank when unknown). The screen's journal
  // field is typed freely, so every rule that reads JONAL reads it again first.
  bool lireJournal();
  // The journal of a new operation into JONAL, by the kind's rule (blank when none).
  void readCreationJournal();
  // Year and month of the operation date, "YYYYMM"; "" while the date is empty.
  std::string anneeMois();
  // Replaces "[PIECE]" in the piece label by the piece number.
  void remplacerPieceDansLibelle();
  // The prefix built from a journal pattern and the operation's year and month.
  std::string prefixe(const Donnee& pattern, const std::string& yearMonth);
  // The label of an account nature letter.
  std::string natureLabel(const std::string& letter);
  // Reads into COMPT the account whose `column` ("NUMCP" or "LIBCP") is `value`,
  // as the lists offer it; false when the account does not exist.
  bool readAccountForCheck(const std::string& column, const Donnee& value);
  // The account check failed: shows `message` and leaves the method result at 1.
  void refuserCompte(Evt* e, const std::string& message);
  // Rounds a VAT amount to the decimals of the operation's currency.
  Decimal arrondiTva(const Decimal& amount);
  // Shows the line being typed again.
  void afficherLigne() { ecran()->fonction(20, "LST"); }
  // Reserves and confirms a new identifier of the counter `table` into `ident`.
  void nouvelIdentifiant(const char* table, Donnee& ident);
  // Completes a line whose account the line account part has just read (VAT code and rate,
  // amounts, analytic codes).
  void completerLigne();
  // Reads into `t` the account `account` among those of nature `nature` ("" any) that
  // the lists offer (CCTRA not "O"); blanks the record and returns false when none.
  static bool readAccountOfNature(Table& t, Champ& numcp, Champ& natuc, Champ& cctra, const std::string& account,
                                  const char* nature);
  // Runs "CTRL_BASCULER" for the operation's currency at its date, with `options`.
  void switchCurrency(const char* options);
  // Whether the document has lines in memory.
  bool hasLines();
  // Hands each line of the document to `add`: the lines in memory or, when there are
  // none, the saved ones (read through MIRVAL2, so that the line typed stays in MIRVAL).
  void forEachLine(const std::function<void(Table& line)>& add);
  // Copies the analytic rows of source line `source` to the line in MIRVAL, each
  // amount through `atNewRate`.
  void copyAnalyticRows(const std::string& source, const std::function<Decimal(const Donnee&)>& atNewRate);

  const registry::OperationKind& kind_;
  std::vector<Part*> parts_;     // in the order they were made
  LineAccount* line_ = nullptr;  // the part that holds the line's account
  LineAccount& line();

  // ---- launch parameters
  Chaine PIDENT{"PIDENT", "", "", 0, this};
  Chaine PMODE{"PMODE", "", "", 0, this};

  // ---- variables
  Chaine V_SAISIE_COMPT{"V_SAISIE_COMPT", "", "", 0, this};
  Chaine V_SAISIE_COMPT2{"V_SAISIE_COMPT2", "", "", 0, this};
  Chaine V_SAISIE_MTT{"V_SAISIE_MTT", "", "", 0, this};
  Monnaie V_HT{"V_HT", "", "", 0, this};
  Monnaie V_TTC{"V_TTC", "", "", 0, this};
  Date DATE_CLOTURE{"DATE_CLOTURE", "Date de clôture", "8", 0, this};
  Date DATE_DEBUT_NOUVEL_E{"DATE_DEBUT_NOUVEL_E", "Date de début du nouvel exercice", "8", 0, this};
  Entier TVA_GR_ACTIF{"TVA_GR_ACTIF", "Gestion TVA 0/1", "", 0, this};
  Entier TVA_GR1_ACTIF{"TVA_GR1_ACTIF", "Gestion TVA s/Débits ou Encaissement 0/1", "", 0, this};
  Entier QTE_GR_ACTIF{"QTE_GR_ACTIF", "Gestion quantité", "", 0, this};
  Entier QTE1_GR_ACTIF{"QTE1_GR_ACTIF", "Gestion qté 1 0/1", "", 0, this};
  Entier QTE2_GR_ACTIF{"QTE2_GR_ACTIF", "Gestion qté 2 0/1", "", 0, this};
  Entier ANA_GR_ACTIF{"ANA_GR_ACTIF", "Gestion Analytique 0/1", "", 0, this};
  Entier ANA_GR1_ACTIF{"ANA_GR1_ACTIF", "Gestion Analytique s/toutes natures de comptes 0/1", "", 0, this};
  Entier ANA_GR2_ACTIF{"ANA_GR2_ACTIF", "Gestion Postes analytiques 0/1", "", 0, this};
  Entier ECHCLI_GR_ACTIF{"ECHCLI_GR_ACTIF", "Gestion Echéances Client 0/1", "", 0, this};
  Entier ECHFOU_GR_ACTIF{"ECHFOU_GR_ACTIF", "Gestion Echéances Fournisseur 0/1", "", 0, this};
  Entier ECHAUT_GR_ACTIF{"ECHAUT_GR_ACTIF", "Gestion Echéances Autres tiers 0/1", "", 0, this};
  Entier ECH_GR_ACTIF{"ECH_GR_ACTIF", "Gestion Echéances 0/1", "", 0, this};
  Entier DEVISE_GR_ACTIF{"DEVISE_GR_ACTIF", "Gestion Devises 0/1", "", 0, this};
  Entier REGT_GR_ACTIF{"REGT_GR_ACTIF", "Gestion Règlements 0/1", "", 0, this};
  Chaine IDENT_ORIGINE{"IDENT_ORIGINE", "", "", 0, this};
  Chaine MONNAIE_ORIGINE{"MONNAIE_ORIGINE", "", "", 0, this};
  Double COURS_ORIGINE{"COURS_ORIGINE", "", "", 0, this};
  Simple VTXTVA{"VTXTVA", "", "", 0, this};
  Entier ANA_O_N{"ANA_O_N", "Le compte peut-il supporter de l'analytique ?", "", 0, this};
  Entier V_CREAT_ACTIF{"V_CREAT_ACTIF", "", "", 0, this};
  Chaine V_CHOIX{"V_CHOIX", "", "", 0, this};
  Chaine V_INFO_FICHE{"V_INFO_FICHE", "", "", 0, this};

  // ---- tables (the main table MIRVAE is the automaton's own)
  Table MIRVAL{this, "", "MIRVAL", ""};
  Table MEM_MIRVAL{this, "", "MEM:MIRVAL", "MEM_MIRVAL"};
  Table MIRVAL2{this, "", "MIRVAL", "MIRVAL2"};
  Table MIRVAANA2{this, "", "MIRVAANA", "MIRVAANA2"};
  Table PARAM{this, "", "PARAM", ""};
  Table JONAL{this, "", "JONAL", ""};
  Table CDTVA{this, "", "CDTVA", ""};
  Table MIRVAANA_M01{this, "", "MIRVAANA_M01", ""};
  Table PIECE{this, "", "PIECE", ""};
  Table COMPT{this, "", "COMPT", ""};
  Table MIRVAL_M01{this, "", "MIRVAL_M01", ""};
  Table MIRVAANA{this, "", "MIRVAANA", ""};
  Table I_MONNAIE{this, "", "I_MONNAIE", ""};

  // ---- fields
  Champ MIRVAE_TYPE{this, "TYPE", table(false)};
  Champ MIRVAE_IDENT{this, "IDENT", table(false)};
  Champ MIRVAE_NUMCP{this, "NUMCP", table(false)};
  Champ MIRVAE_DATEC{this, "DATEC", table(false)};
  Champ MIRVAE_HEUREC{this, "HEUREC", table(false)};
  Champ MIRVAE_DATEM{this, "DATEM", table(false)};
  Champ MIRVAE_HEUREM{this, "HEUREM", table(false)};
  Champ MIRVAE_USERM{this, "USERM", table(false)};
  Champ MIRVAE_DTOPE{this, "DTOPE", table(false)};
  Champ MIRVAE_NPIES{this, "NPIES", table(false)};
  Champ MIRVAE_MONNAIE_IDENT{this, "MONNAIE_IDENT", table(false)};
  Champ MIRVAE_COURS{this, "COURS", table(false)};
  Champ MIRVAE_NPIEC{this, "NPIEC", table(false)};
  Champ MIRVAE_INPIE{this, "INPIE", table(false)};
  Champ MIRVAE_NUMJL{this, "NUMJL", table(false)};
  Champ MIRVAE_DTECH{this, "DTECH", table(false)};
  Champ MIRVAE_SAISIE_MTT{this, "SAISIE_MTT", table(false)};
  Champ MIRVAE_HT{this, "HT", table(false)};
  Champ MIRVAE_TVA{this, "TVA", table(false)};
  Champ MIRVAE_TTC{this, "TTC", table(false)};
  Champ MIRVAL_IDENT{"IDENT", &MIRVAL};
  Champ MIRVAL_NUMERO{"NUMERO", &MIRVAL};
  Champ MIRVAL_NUMCP{"NUMCP", &MIRVAL};
  Champ MIRVAL_LIBEC{"LIBEC", &MIRVAL};
  Champ MIRVAL_COTVA{"COTVA", &MIRVAL};
  Champ MIRVAL_TXTVA{"TXTVA", &MIRVAL};
  Champ MIRVAL_HT{"HT", &MIRVAL};
  Champ MIRVAL_TVA{"TVA", &MIRVAL};
  Champ MIRVAL_TTC{"TTC", &MIRVAL};
  Champ MIRVAL_CPOST{"CPOST", &MIRVAL};
  Champ MIRVAL_CCRIT{"CCRIT", &MIRVAL};
  Champ MEM_MIRVAL_HT{"HT", &MEM_MIRVAL};
  Champ MEM_MIRVAL_TVA{"TVA", &MEM_MIRVAL};
  Champ MEM_MIRVAL_TTC{"TTC", &MEM_MIRVAL};
  Champ MIRVAL2_IDENT{"IDENT", &MIRVAL2};
  Champ MIRVAL2_NUMERO{"NUMERO", &MIRVAL2};
  Champ MIRVAL2_HT{"HT", &MIRVAL2};
  Champ MIRVAL2_TVA{"TVA", &MIRVAL2};
  Champ MIRVAL2_TTC{"TTC", &MIRVAL2};
  Champ MIRVAANA_IDENT{"IDENT", &MIRVAANA};
  Champ MIRVAANA_NUMERO{"NUMERO", &MIRVAANA};
  Champ MIRVAANA_MTADE{"MTADE", &MIRVAANA};
  Champ MIRVAANA_MTACR{"MTACR", &MIRVAANA};
  Champ MIRVAANA2_IDENT{"IDENT", &MIRVAANA2};
  Champ MIRVAANA2_NUMERO{"NUMERO", &MIRVAANA2};
  Champ MIRVAANA2_MTADE{"MTADE", &MIRVAANA2};
  Champ MIRVAANA2_MTACR{"MTACR", &MIRVAANA2};
  Champ MIRVAANA_M01_IDENT{"IDENT", &MIRVAANA_M01};
  Champ MIRVAANA_M01_NUMERO{"NUMERO", &MIRVAANA_M01};
  Champ MIRVAANA_M01_MTADE{"MTADE", &MIRVAANA_M01};
  Champ MIRVAANA_M01_MTACR{"MTACR", &MIRVAANA_M01};
  Champ COMPT_NUMCP{"NUMCP", &COMPT};
  Champ COMPT_LIBCP{"LIBCP", &COMPT};
  Champ COMPT_NATUC{"NATUC", &COMPT};
  Champ COMPT_CCTRA{"CCTRA", &COMPT};
  Champ COMPT_CSECT{"CSECT", &COMPT};
  Champ COMPT_SAANA{"SAANA", &COMPT};
  Champ PIECE_NPIES{"NPIES", &PIECE};
  Champ PIECE_IMPUT{"IMPUT", &PIECE};
  Champ PARAM_PNUME{"PNUME", &PARAM};
  Champ PARAM_MONNAIE_IDENT{"MONNAIE_IDENT", &PARAM};
  Champ PARAM_MONNAIE_CMP_IDENT{"MONNAIE_CMP_IDENT", &PARAM};
  Champ PARAM_PDDEX{"PDDEX", &PARAM};
  Champ PARAM_PDFEX{"PDFEX", &PARAM};
  Champ PARAM_PDTCL{"PDTCL", &PARAM};
  Champ JONAL_NUMJL{"NUMJL", &JONAL};
  Champ JONAL_TYPJL{"TYPJL", &JONAL};
  Champ JONAL_NUMEROPI{"NUMEROPI", &JONAL};
  Champ JONAL_PREFIXPI{"PREFIXPI", &JONAL};
  Champ JONAL_PREFIXIN{"PREFIXIN", &JONAL};
  Champ JONAL_CLOAM{"CLOAM", &JONAL};
  Champ JONAL_RAZPI{"RAZPI", &JONAL};
  Champ CDTVA_COTVA{"COTVA", &CDTVA};
  Champ CDTVA_TYTVA{"TYTVA", &CDTVA};
  Champ I_MONNAIE_IDENT{"IDENT", &I_MONNAIE};
};

}  // namespace entry
