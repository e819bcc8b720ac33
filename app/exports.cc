#include "app/exports.h"

#include <iomanip>
#include <sstream>

#include "host/currency.h"
#include "host/decimal.h"

namespace app {

using host::Decimal;
using host::Statement;

namespace {

Decimal amount(const std::string& text) { return text.empty() ? Decimal() : *Decimal::parse(text); }

std::string keepingCurrency(host::Database& db) {
  Statement& s = db.prepare("SELECT MONNAIE_IDENT FROM PARAM WHERE PNUME = 1");
  std::string currency = s.step() ? s.text(0) : "";
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
  std::string npies, npiec, numjl, dtope, label, currency;
};

std::vector<Piece> pieces(host::Database& db) {
  std::vector<Piece> out;
  Statement& s = db.prepare(
      "SELECT NPIES, NPIEC, NUMJL, DTOPE, CASE WHEN LIBPI <> '' THEN LIBPI ELSE INPIE END, MONNAIE_IDENT "
      "FROM PIECE ORDER BY NPIES");
  while (s.step()) out.push_back({s.text(0), s.text(1), s.text(2), s.text(3), s.text(4), s.text(5)});
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
  Decimal totalDebit, totalCredit;
  for (const auto& p : all) {
    out << "Pièce " << p.npies << "  journal " << p.numjl << "  n° " << p.npiec << "  du " << p.dtope << "  "
        << p.label << "\n";
    Statement& m = db.prepare("SELECT NLIGS, NUMCP, LIBEC, MTDEB, MTCRE FROM MOUVE WHERE NPIES = ? ORDER BY NLIGS");
    m.bind(1, p.npies);
    while (m.step()) {
      Decimal debit = amount(m.text(3)), credit = amount(m.text(4));
      totalDebit += debit;
      totalCredit += credit;
      out << "    " << std::left << std::setw(16) << m.text(0) << std::setw(10) << m.text(1) << std::setw(36)
          << m.text(2).substr(0, 34) << std::right << std::setw(14)
          << (debit.isZero() ? "" : host::amountText(debit, decimals)) << std::setw(14)
          << (credit.isZero() ? "" : host::amountText(credit, decimals)) << "\n";
    }
    m.reset();
    Statement& e = db.prepare("SELECT DTECH, MTECH FROM ECHEA WHERE NPIES = ? ORDER BY NUSYS");
    e.bind(1, p.npies);
    while (e.step())
      out << "    échéance du " << e.text(0) << " : " << host::amountText(amount(e.text(1)), decimals) << "\n";
    e.reset();
  }
  out << "Total des mouvements : débit " << host::amountText(totalDebit, decimals) << " " << currency
      << ", crédit " << host::amountText(totalCredit, decimals) << " " << currency << "\n";
}

void exporterHledger(host::Database& db, std::ostream& out) {
  std::string currency = keepingCurrency(db);
  const int decimals = keepingDecimals(db, currency);
  out << "; ledger of the dossier, amounts in " << currency << "\n\n";
  for (const auto& p : pieces(db)) {
    out << p.dtope << " (" << (p.npiec.empty() ? p.npies : p.npiec) << ") " << p.label << "\n";
    out << "    ; piece: " << p.npies << ", journal: " << p.numjl << "\n";
    Statement& m = db.prepare("SELECT NUMCP, MTDEB, MTCRE FROM MOUVE WHERE NPIES = ? ORDER BY NLIGS");
    m.bind(1, p.npies);
    while (m.step()) {
      Decimal value = amount(m.text(1)) - amount(m.text(2));
      out << "    " << m.text(0) << "    " << host::amountText(value, decimals) << " " << currency << "\n";
    }
    m.reset();
    out << "\n";
  }
}

}  // namespace app
