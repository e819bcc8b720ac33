#include "model/step.h"

#include "host/session.h"

namespace model {

bool stopped(const host::Automate& a) { return a.estTermine() || a.session().actionEchouee(); }

Outcome step(host::Automate& a, std::string_view event, host::Evt* e) {
  if (stopped(a)) return Outcome::stopped;
  if (!a.aBranche(event)) return Outcome::accepted;
  // A step may run inside another handler (the base of "VALIDATION" runs the data
  // steps): the caller's refusal and result code are put back as they were.
  bool caller_refused = a.refuse();
  int caller_code = a.erreurMethode();
  a.oublierRefus();
  a.executer(event, e);
  bool refused = a.refuse();
  a.oublierRefus();
  if (caller_refused) a.rejeter(nullptr);
  a.erreurMethode(caller_code, nullptr);
  if (stopped(a)) return Outcome::stopped;
  return refused ? Outcome::refused : Outcome::accepted;
}

}  // namespace model
