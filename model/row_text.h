// One row of a list as the user sees it.
#pragma once

#include <map>
#include <string>

namespace model {

// Field values under "TABLE.FIELD" and under the bare field name, and the screen
// variables by name ("VLIBCP2"); a variable shadows a bare field name of the same
// name. Values are the texts shown (dates DD/MM/YYYY).
using RowText = std::map<std::string, std::string>;

}  // namespace model
