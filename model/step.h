// One standard step of a model cycle: run an event by name if the automaton
// answers it, and tell the cycle whether to go on.
//
// Every cycle of the model library (access screen, document, process, print job)
// is a sequence of steps. A step whose event the automaton does not answer (no own
// branch, no model branch) is accepted without running anything. A cycle stops as
// soon as a handler left the automaton (sortir) or the user action failed (a host
// error was reported): nothing after that point may run on half-done work.
#pragma once

#include <string_view>

#include "host/automate.h"

namespace model {

enum class Outcome {
  accepted,  // the step ran (or did not exist) and nobody refused it
  refused,   // a handler called rejeter()
  stopped,   // the automaton left, or the user action failed
};

// Runs `event` on `a` with `e` (null: an empty event). The refusal flag is cleared
// before the step, so `refused` means this step was refused; afterwards the
// refusal flag and the result code are those the caller had.
Outcome step(host::Automate& a, std::string_view event, host::Evt* e = nullptr);

// True when the automaton left or the current user action failed.
bool stopped(const host::Automate& a);

}  // namespace model
