// "CPMESSAG"/"INTERFACE": the application's message boxes. Every text goes to the
// session's user port and is recorded in the transcript; "@" in a text starts a line.
//
//   "MESS_OK"  (text)                  shows the text with an OK button.
//   "MESS_ON"  (text)                  asks the text as a yes/no question; the
//                                      method result is 1 when the user answers yes,
//                                      0 otherwise.
//   "MESS_OK2" (text, answer out)      shows the text with two buttons, "1~OK" and
//                                      "2~Voir le mémo"; the answer's code ("1" or "2")
//                                      is written into the second parameter.
//   "MESS_OK3" (memo)                  shows a memo: the label text stored under the
//                                      memo's name ("MEMO1.TXT"), or says it is missing.
#pragma once

#include "host/automate.h"

namespace services {

class Cpmessag : public host::Automate {
 public:
  explicit Cpmessag(host::Evt* e);

  void mess_ok(host::Evt* e);
  void mess_on(host::Evt* e);
  void mess_ok2(host::Evt* e);
  void mess_ok3(host::Evt* e);
};

// "MIRVAE"/"MOD_CAL_BIBLIOPROC": the module's own library procedures.
//
//   "ERREUR_TABLE" (automaton code, step, table error code)   shows the user which
//                                      step of which screen could not read or write a row.
class MirvaeBiblioproc : public host::Automate {
 public:
  explicit MirvaeBiblioproc(host::Evt* e);

  void erreur_table(host::Evt* e);
};

// The yes/no question of "MESS_ON", shared with the accounting library's own:
// asks parameter 0 and sets the method result of `self` (1 yes, 0 no).
// Returns the answer.
bool questionOuiNon(host::Automate& self, host::Evt* e);

}  // namespace services
