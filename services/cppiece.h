// The ledger's piece import component, "CPPIECE-INTERFACE".
//
// A posting process hands it one piece row by row: it writes a row into a transfer
// table (PIECE_IMM, MOUVE_IMM, ECHEA_IMM, VTSEC_IMM) tagged with the instance
// number, then calls the procedure that consumes the newest row of that table:
//
//   "DEBUT_IMPORT" (NINST by reference)      opens an import instance
//   "DEBUT_PIECE"  (NPIES by reference)      reads PIECE_IMM, gives the piece number
//   "DEBUT_LIGNE"  ([UNIQ by reference])     reads MOUVE_IMM, gives the movement identifier
//   "ANALYTIQUE", "ECHEANCE"                 read VTSEC_IMM / ECHEA_IMM for the open movement
//   "FIN_LIGNE"                              closes the movement
//   "FIN_PIECE"    ("O" by reference)        checks the piece and records it ("N": drops it)
//   "FIN_IMPORT"                             closes the instance
//   "POSDEBUT_ERREUR" (NINST)                rewinds the instance's error texts
//   "ERREUR_SUIVANTE" (code, text, NINST)    next error text of that code, "" when none left
//
// The piece is kept in memory until "FIN_PIECE", which checks it in one place
// (journal, date, accounts, currency, balance) and writes PIECE, MOUVE, VTSEC and ECHEA
// at once, or refuses it whole with code 10 and one French text per fault in
// IMPORT_ERREUR. A piece never closed leaves nothing in the ledger.
//
// Amounts are kept as sent in the piece's currency (MTDEBS, MTCRES, MTECHS, VTSEC) and
// valued in the dossier's keeping currency (MTDEB, MTCRE, MTECH) at the piece's rate
// (units for one euro; the parity of a fixed-rate currency), rounded to the keeping
// currency's decimals; the rounding difference, if any, goes to the largest movement
// of the side that falls short, so that the piece balances in both currencies.
//
// Numbers only go up and are never handed out twice, even when their piece is
// refused or removed later: counters of NDOC ("PIECE", "MOUVE", "VTSEC", "ECHEA",
// "IMPORT_INSTANCE"), never below the largest number already in the ledger. NPIES is
// 11 digits; a movement's NLIGS is NPIES then its line on 4 digits; INDX2 is the
// account, "|" and the date as YYYY-MM-DD, so that a range over one account's
// movements compares as dates (a bound written DDMMYYYY must be brought to that form).
//
// Results (erreurMethode): 0 done; 10 piece refused (texts to read); 1 no import
// instance open; 2 no piece open, or one already open; 3 no movement open, or one
// still open; 4 the transfer row to read is missing; 5 unknown instance; 6 bad
// parameter; 99 the procedure failed inside (the host reports why).
#pragma once

#include <functional>
#include <string>

namespace services {

// Registers "CPPIECE-INTERFACE" once per process; later calls do nothing.
void chargerGrandLivre();

// Results of the component's procedures.
enum ImportResult {
  kImportOk = 0,
  kNoInstance = 1,
  kPieceState = 2,
  kMovementState = 3,
  kMissingRow = 4,
  kUnknownInstance = 5,
  kBadParameter = 6,
  kPieceRefused = 10,
  kInternalFailure = 99,
};

// For tests only: watches and disturbs the component of this process. Production
// code never sets it.
struct ImportTestHooks {
  // Called at each procedure call, with its name and, for "DEBUT_LIGNE", the account
  // of the movement row it is about to read.
  std::function<void(const std::string& procedure, const std::string& account)> onCall;
  // The `failOccurrence`-th call (from 1) of `failProcedure` returns `failCode`
  // and does nothing else.
  std::string failProcedure;
  int failOccurrence = 0;
  int failCode = 0;
  int seen = 0;  // calls of failProcedure so far
};
ImportTestHooks& importTestHooks();

}  // namespace services
