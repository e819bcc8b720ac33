#include "model/interface.h"

namespace model {

Interface2::Interface2(Evt* e) : Interface(e) {}
void Interface2::impression(Evt*) {}
std::string Interface2::printJobFor(const std::string&) const { return ""; }

}  // namespace model
