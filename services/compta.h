// The accounting library "COMPTA": its procedure module "MOD_CAL_BIBLIOPROC" and the
// modules the library runs to their end. Results come back in the caller's variables
// (parameters by reference) and in the method result.
//
// "COMPTA-MOD_CAL_BIBLIOPROC", procedures (parameters in order):
//   "VERIF_DOSSIER" (flag out)         1 when the PARAM row exists and its dates hold
//       together (start <= end, closing date set and not before the start); else 0,
//       after telling the user what is wrong.
//   "CALCUL_DATE_NOUVEL_EX" (end of exercise, start of the next out)   the day after.
//   "TABLE_ANNEE_MOIS" (exercise start, start of the next, closing date)   empties
//       MEM02 and writes one row per month from the start's to the closing date's,
//       in order, ANMOI "YYYYMM".
//   "OPTIONS_DOSSIER" (14 flags out)   the dossier options PARAM.OPT_TVA, OPT_TVA1,
//       OPT_QTE, OPT_QTE1, OPT_QTE2, OPT_ANA, OPT_ANA1, OPT_ANA2, OPT_ECHCLI,
//       OPT_ECHFOU, OPT_ECHAUT, OPT_ECH, OPT_DEVISE, OPT_REGT, each 0 or 1.
//   "LECTURE_HISTO_TXTVA" (VAT code, date, rate out)   the rate in force that day
//       (HISTVA row with the latest DTDEB on or before it; an empty date is today);
//       none: rate 0 and method result 1.
//   "INCREMENTE_NUMERO_PIECE" (journal, counter key, number out, error out)   draws
//       the next number of the journal's counter (NUMPI) for the key "N", "N+1" or
//       a year-month "YYYYMM". Error 0: drawn. 1: drawn, but the counter could not be
//       updated. 2: the counter is held by another process; nothing drawn, counter
//       untouched. Inside a user action the unit of work already holds the dossier,
//       so two processes never draw the same number.
//   "PREFIXE_NUMERO_PIECE" (pattern, year-month "YYYYMM", prefix out)   the pattern
//       with "[AAAA]", "[AA]" and "[MM]" replaced by the year, its last two digits and
//       the month; any other text is kept as it is.
//   "LIBELLE_NATURE_COMPTE" (nature letters, label out)   the label of each letter
//       (label code "NATURE_<letter>"), joined by " / " when there are several.
//   "CALCUL_CUMULS_COMPTE" (account, kind, from, to, debit out, credit out, currency)
//       the totals of the account's ledger movements dated from `from` to `to` (an
//       empty bound does not limit), exact, in the keeping currency, or converted at
//       the rate of `to` and rounded when another currency is asked.
//   "MESS_ON" (text[, answer out])     the yes/no question of "CPMESSAG"; the answer,
//       1 for yes, also lands in the second parameter when there is one.
//   and the piece-removal procedures of the ledger (services/ledger.h).
//
// Modules (appelerModule "COMPTA", module name), each runs to its end:
//   "VISUECRI" (piece number)          shows the ledger piece, header and movements.
//   "LANCE_REOUVERTURE_ANNU" (calling module)   a closed exercise (PARAM.PXCLO "C")
//       is reopened (PXCLO "N") when the user confirms.
//   "CHOIX_MODELE_ECRITURES" (chosen out, model code in/out, dossier, journal)   the
//       choice window of the entry models of a journal; a pick writes the model code
//       and 1, a cancel leaves the code and writes 0.
#pragma once

#include "host/automate.h"
#include "host/table.h"
#include "model/traitmnt.h"

namespace services {

class Compta : public host::Automate {
 public:
  explicit Compta(host::Evt* e);

  void verif_dossier(host::Evt* e);
  void calcul_date_nouvel_ex(host::Evt* e);
  void table_annee_mois(host::Evt* e);
  void options_dossier(host::Evt* e);
  void lecture_histo_txtva(host::Evt* e);
  void incremente_numero_piece(host::Evt* e);
  void prefixe_numero_piece(host::Evt* e);
  void libelle_nature_compte(host::Evt* e);
  void calcul_cumuls_compte(host::Evt* e);
  void mess_on(host::Evt* e);

 private:
  // Reads the PARAM row; false when the dossier has none.
  bool lireParametres();

  host::Table PARAM{this, "", "PARAM", ""};
  host::Champ PNUME{"PNUME", &PARAM};
  host::Table MEM02{this, "", "MEM02", ""};
  host::Champ ANMOI{"ANMOI", &MEM02};
};

class Visuecri : public model::Traitmnt {
 public:
  explicit Visuecri(host::Evt* e) : Traitmnt(e) {}
  void faire(host::Evt* e) override;
};

class Lance_reouverture_annu : public model::Traitmnt {
 public:
  explicit Lance_reouverture_annu(host::Evt* e) : Traitmnt(e) {}
  void faire(host::Evt* e) override;
};

class Choix_modele_ecritures : public model::Traitmnt {
 public:
  explicit Choix_modele_ecritures(host::Evt* e) : Traitmnt(e) {}
  void faire(host::Evt* e) override;
};

// "CHOIX_TABLE_TYPFR" (expense types) and "CHOIX_TABLE_TYPLB" (standard piece
// labels): the choice window of a table of standard texts, (code out, result out).
// The result is "0" with the chosen code, "1" when the window was closed without one.
class Choix_table : public model::Traitmnt {
 public:
  Choix_table(host::Evt* e, const char* window, const char* table, const char* code, const char* label);
  void faire(host::Evt* e) override;

 private:
  const char* window_;
  const char* table_;
  const char* code_;
  const char* label_;
};

class Choix_table_typfr : public Choix_table {
 public:
  explicit Choix_table_typfr(host::Evt* e) : Choix_table(e, "Types de frais", "TYPFR", "CTYFR", "ITYFR") {}
};

class Choix_table_typlb : public Choix_table {
 public:
  explicit Choix_table_typlb(host::Evt* e) : Choix_table(e, "Libellés types", "TYPLB", "CTYLB", "ITYLB") {}
};

}  // namespace services
