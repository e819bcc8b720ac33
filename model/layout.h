// Layouts: how a print job's document looks on paper, kept apart from the job so
// that a layout can change without touching a job. A layout names the values it
// prints (model/impression.h: the job's variables, "TABLE.FIELD" for fields); the
// job only fills them. Layouts are registered by the print job's module name.
#pragma once

#include <functional>
#include <optional>
#include <string>
#include <vector>

#include "model/impression.h"

namespace model {

enum class Format {
  text,    // as it is, wrapped on words (or anywhere in a word longer than the column)
  amount,  // "1 234,56", the currency's decimals, right-aligned
  rate,    // "19,6", right-aligned
  date,    // as it is, on one line
};

struct Zone {
  std::string title;  // the label or the column heading
  std::string name;   // the value printed
  Format format = Format::text;
  double width = 1;    // a column's share of the page width
  bool total = false;  // a list column summed at the end
};

// A VAT breakdown under a form's lines: per rate, the sums of the lines' amounts.
struct VatBreakdown {
  std::string rate, base, vat;  // names of the line values
};

struct Layout {
  std::string title;
  // A form prints each record on pages of its own with its lines; a list prints one
  // row per record.
  bool form = false;
  std::vector<Zone> heading;         // labelled values under the title (a list: its criteria)
  std::vector<std::string> address;  // the account's name and address lines (none: no block)
  std::vector<Zone> columns;         // a form's lines, a list's rows
  std::optional<VatBreakdown> vat;
  std::vector<Zone> totals;          // a form's labelled amounts under its lines
  std::string currency;              // name of the value holding the currency code
};

// The company that prints, as the dossier holds it: lines it does not hold are empty
// and print nothing.
struct Company {
  std::string name;
  std::vector<std::string> address;
  std::string siren;
};

void registerLayout(const std::string& module, Layout layout);
// The layout of a print job's module; nullptr when none is registered.
const Layout* layoutFor(const std::string& module);

// Writes `document` laid out by `layout` as an A4 PDF file at `path`. `decimals` gives
// a currency code's decimals. Throws HostError when the file cannot be written.
void writePdf(const Layout& layout, const Impression& document, const Company& company,
              const std::function<int(const std::string&)>& decimals, const std::string& path);

}  // namespace model
