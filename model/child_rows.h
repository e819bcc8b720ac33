// Rows that hang on a line of a document, as its analytic rows and its settlement
// rows do: an analytic row's NUMERO is the line's IDENT followed by "|" (the bar keeps
// a line without identifier from selecting every row), a settlement row's IDENTR the
// line's IDENT itself. While the document is entered they
// live in the session's work table, once it is saved in the dossier's table; these
// copy, convert and remove them one line at a time, for every kind of child row alike.
#pragma once

#include <functional>
#include <initializer_list>
#include <string>

#include "host/table.h"

namespace model {

// The field of a child table that names its line, and how it names it.
struct LineKey {
  enum Form { IdentAndBar, Ident };
  // Implicit: a field alone is one that holds the line's IDENT and a bar.
  LineKey(host::Champ& field, Form form = IdentAndBar) : field(field), form(form) {}  // NOLINT
  host::Champ& field;
  Form form;
};

// Copies the rows of `line` from `from` (whose NUMERO field is `fromNumero`) into
// `to`: each is blanked, filled from the source row by column name, handed to
// `adjust` when there is one (the source row is still in `from`'s buffer), then
// inserted. Both tables' requests are reset afterwards.
void copyChildRows(host::Table& from, LineKey fromNumero, host::Table& to, const std::string& line,
                   const std::function<void()>& adjust = nullptr);

// Puts each of the `amounts` of the rows of `line` in `table` through `convert`, as a
// line's own amounts go when its document changes currency; the request is reset.
void convertChildRows(host::Table& table, LineKey numero, const std::string& line,
                      std::initializer_list<host::Champ*> amounts,
                      const std::function<host::Decimal(const host::Decimal&)>& convert);

// Deletes the rows of `line` from `table`, without confirmation; its request is reset.
void removeChildRows(host::Table& table, LineKey numero, const std::string& line);

}  // namespace model
