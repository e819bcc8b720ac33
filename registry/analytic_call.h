// The call of the analytic breakdown screen "MIRVAE-GEST_ANA" by an entry screen:
// its launch parameters by name, so that the caller and the screen place and read
// each one at the same position.
#pragma once

namespace registry::analytic {

enum Param : int {
  PIDENT,                // the line broken down (MIRVAL.IDENT, key of MIRVAL_M01)
  PMODE,                 // the screen's entry mode; "V..." is consultation
  P_DTOPE,               // operation date
  P_COURS,               // exchange rate of the entry currency
  P_CPOST,               // analytic post of the account, in and out
  P_CCRIT,               // distribution key of the account, in and out
  P_CSECT,               // default section of the account
  P_MTDEBS,              // the line's debit in entry currency
  P_MTCRES,              // the line's credit in entry currency
  P_SIGNE,               // -1 when a negative line was turned to the other side
  P_SAISIE_OBLIGATOIRE,  // "O" when the breakdown is mandatory
  kCount,
};

}  // namespace registry::analytic
