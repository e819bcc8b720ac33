#include "app/exports.h"

#include <iomanip>
#include <sstream>

#include "host/currency.h"
#include "host/decimal.h"
#include "host/error.h"
#include "host/text.h"
#include "host/value.h"

namespace app {

using host::Decimal;
using host::Statement;

namespace {

// The row a statement stands on, read as the exports need it. Its first column is
// the row's key: a value that cannot be written out faithfully (an amount that is
// not one, a date that is not a day, a text that is not clean UTF-8) is reported by
// table, row and column, so that a person can find it and put it right.
class StoredRow {
 public:
  StoredRow(const char* table, Statement& s) : table_(table), s_(s) {}

  std::string text(int column) const {
    std::string value = s_.text(column);
    if (auto why = host::text::flaw(value)) malformed(column, *why);
    return value;
  }
  Decimal amount(int column) const {
    std::string value = text(column);
    if (value.empty()) return Decimal();
    auto parsed = Decimal::parse(value);
    if (!parsed) malformed(column, "« " + value + " » n'est pas un montant");
    return *parsed;
  }
  // A stored day, in its stored form (YYYY-MM-DD).
  std::string day(int column) const {
    std::string value = text(column);
    auto parsed = host::lireJour(value);
    if (!parsed || !*parsed || host::jourIso(*parsed) != value)
      malformed(column, "« " + value + " » n'est pas une date AAAA-MM-JJ");
    return value;
  }

 private:
  [[noreturn]] void malformed(int column, const std::string& why) const {
    std::string key = s_.text(0);
    if (host::text::flaw(key)) key = "?";
    throw host::HostError("valeur illisible dans le grand livre : table " + std::string(table_) + ", ligne " +
                          s_.columnName(0) + " = " + key + ", colonne " + s_.columnName(column) + " : " + why);
  }

  const char* table_;
  Statement& s_;
};

// `text` cut to `keep` characters, then padded with blanks to `width` characters:
// a column of a listing counts what a person sees, not bytes.
std::string column(const std::string& text, std::size_t width, std::size_t keep) {
  std::string out = host::text::substring(text, 1, static_cast<long>(keep));
  std::size_t shown = host::text::length(out);
  if (shown < width) out.append(width - shown, ' ');
  return out;
}

std::string keepingCurrency(host::Database& db) {
  Statement& s = db.prepare("SELECT PNUME, MONNAIE_IDENT FROM PARAM WHERE PNUME = 1");
  std::string currency = s.step() ? StoredRow("PARAM", s).text(1) : "";
  s.reset();
  return currency.empty() ? "EUR" : currency;
}

// Decimals of the keeping currency, in which the ledger's amounts are.
int keepingDecimals(host::Database& db, const std::string& currency) {
  Statement& s = db.prepare("SELECT DECIMALES FROM MONNAIE WHERE IDENT = ?");
  s.bind(1, currency);
  int decimals = s.step() ? static_cast<int>(s.integer(0)) : 2;
  s.reset();
  return decimals;
}

struct Piece {
  std::string npies, npiec, numjl, dtope, label;
};

std::vector<Piece> pieces(host::Database& db) {
  std::vector<Piece> out;
  Statement& s = db.prepare("SELECT NPIES, NPIEC, NUMJL, DTOPE, LIBPI, INPIE FROM PIECE ORDER BY NPIES");
  while (s.step()) {
    StoredRow row("PIECE", s);
    std::string label = row.text(4);
    out.push_back({row.text(0), row.text(1), row.text(2), row.day(3), label.empty() ? row.text(5) : label});
  }
  s.reset();
  return out;
}

}  // namespace

void imprimerGrandLivre(host::Database& db, std::ostream& out) {
  std::string currency = keepingCurrency(db);
  const int decimals = keepingDecimals(db, currency);
  auto all = pieces(db);
  if (all.empty()) {
    out << "Grand livre vide.\n";
    return;
  }
  std::ostringstream listing;
  Decimal totalDebit, totalCredit;
  for (const auto& p : all) {
    listing << "Pièce " << p.npies << "  journal " << p.numjl << "  n° " << p.npiec << "  du " << p.dtope << "  "
            << p.label << "\n";
    Statement& m =
        db.prepare("SELECT UNIQ, NLIGS, NUMCP, LIBEC, MTDEB, MTCRE FROM MOUVE WHERE NPIES = ? ORDER BY NLIGS");
    m.bind(1, p.npies);
    while (m.step()) {
      StoredRow row("MOUVE", m);
      Decimal debit = row.amount(4), credit = row.amount(5);
      totalDebit += debit;
      totalCredit += credit;
      listing << "    " << column(row.text(1), 16, 16) << column(row.text(2), 10, 10) << column(row.text(3), 36, 34)
              << std::right << std::setw(14) << (debit.isZero() ? "" : host::amountText(debit, decimals))
              << std::setw(14) << (credit.isZero() ? "" : host::amountText(credit, decimals)) << "\n";
      // The movement's analytic rows, each on its side.
      Statement& a = db.prepare("SELECT CSECT, MTADE, MTACR FROM VTSEC WHERE MOUVE_UNIQ = ? ORDER BY UNIQ");
      a.bind(1, m.integer(0));
      while (a.step()) {
        StoredRow section("VTSEC", a);
        Decimal sectionDebit = section.amount(1), sectionCredit = section.amount(2);
        listing << "    " << std::left << std::setw(26) << "" << column("section " + section.text(0), 36, 34)
                << std::right << std::setw(14) << (sectionDebit.isZero() ? "" : host::amountText(sectionDebit, decimals))
                << std::setw(14) << (sectionCredit.isZero() ? "" : host::amountText(sectionCredit, decimals)) << "\n";
      }
      a.reset();
    }
    m.reset();
    // Each due date with its state: open, paid in part (the rest is the next due date
    // of the same movement) or settled, with the piece that paid it and its lettering.
    Statement& e = db.prepare(
        "SELECT NUSYS, DTECH, MTECH, UNIQR, MTPAY, MTRES, RELET, "
        "coalesce((SELECT NPIES FROM MOUVE WHERE MOUVE.UNIQ = ECHEA.UNIQR), '') FROM ECHEA WHERE NPIES = ? "
        "ORDER BY NUSYS");
    e.bind(1, p.npies);
    while (e.step()) {
      StoredRow row("ECHEA", e);
      listing << "    échéance du " << row.day(1) << " : " << host::amountText(row.amount(2), decimals);
      if (e.integer(3) == 0)
        listing << ", ouverte";
      else if (row.amount(5).isZero())
        listing << ", réglée (" << host::amountText(row.amount(4), decimals) << ") par la pièce " << row.text(7)
                << ", lettrage " << row.text(6);
      else
        listing << ", payée en partie (" << host::amountText(row.amount(4), decimals) << ") par la pièce "
                << row.text(7) << ", reste " << host::amountText(row.amount(5), decimals);
      listing << "\n";
    }
    e.reset();
  }
  listing << "Total des mouvements : débit " << host::amountText(totalDebit, decimals) << " " << currency
          << ", crédit " << host::amountText(totalCredit, decimals) << " " << currency << "\n";
  out << listing.str();
}

void exporterHledger(host::Database& db, std::ostream& out) {
  std::string currency = keepingCurrency(db);
  const int decimals = keepingDecimals(db, currency);
  std::ostringstream journal;
  journal << "; ledger of the dossier, amounts in " << currency << "\n\n";
  for (const auto& p : pieces(db)) {
    journal << p.dtope << " (" << (p.npiec.empty() ? p.npies : p.npiec) << ") " << p.label << "\n";
    journal << "    ; piece: " << p.npies << ", journal: " << p.numjl << "\n";
    Statement& m = db.prepare("SELECT UNIQ, NUMCP, MTDEB, MTCRE FROM MOUVE WHERE NPIES = ? ORDER BY NLIGS");
    m.bind(1, p.npies);
    while (m.step()) {
      StoredRow row("MOUVE", m);
      Decimal value = row.amount(2) - row.amount(3);
      journal << "    " << row.text(1) << "    " << host::amountText(value, decimals) << " " << currency << "\n";
    }
    m.reset();
    journal << "\n";
  }
  out << journal.str();
}

}  // namespace app
