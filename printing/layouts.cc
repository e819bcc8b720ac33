#include "printing/layouts.h"

#include <string>

#include "model/layout.h"

namespace printing {

namespace {

using model::Format;
using model::Layout;
using model::Zone;

// What tells one kind's prints from another's.
struct KindPrint {
  int number;
  const char* form;   // a form's title
  const char* list;   // a list's title
  const char* account;  // the heading of the operation's account
  bool dueDate;       // invoices and expense notes fall due
  bool treasury;      // bank and cash: a direction, amounts signed by it
  bool lines;         // a miscellaneous operation's lines carry their own sides
};

constexpr KindPrint kKinds[] = {
    {.number = 1, .form = "Facture client", .list = "Factures clients", .account = "Client", .dueDate = true,
     .treasury = false, .lines = false},
    {.number = 2, .form = "Facture fournisseur", .list = "Factures fournisseurs", .account = "Fournisseur",
     .dueDate = true, .treasury = false, .lines = false},
    {.number = 3, .form = "Note de frais", .list = "Notes de frais", .account = "Compte", .dueDate = true,
     .treasury = false, .lines = false},
    {.number = 4, .form = "Opération de banque", .list = "Opérations de banque", .account = "Banque",
     .dueDate = false, .treasury = true, .lines = false},
    {.number = 5, .form = "Opération de caisse", .list = "Opérations de caisse", .account = "Caisse",
     .dueDate = false, .treasury = true, .lines = false},
    {.number = 6, .form = "Opération diverse", .list = "Opérations diverses", .account = "", .dueDate = false,
     .treasury = false, .lines = true},
};

Zone text(const char* title, const char* name, double width = 1) {
  return {.title = title, .name = name, .format = Format::text, .width = width, .total = false};
}
Zone date(const char* title, const char* name, double width = 1) {
  return {.title = title, .name = name, .format = Format::date, .width = width, .total = false};
}
// Amounts of a list are summed at its end.
Zone amount(const char* title, const char* name, double width = 1.25) {
  return {.title = title, .name = name, .format = Format::amount, .width = width, .total = true};
}

Layout titled(const char* title, bool form) {
  Layout l;
  l.title = title;
  l.form = form;
  l.currency = "MIRVAE.MONNAIE_IDENT";
  return l;
}

Layout formOf(const KindPrint& k) {
  Layout l = titled(k.form, true);
  l.heading = {text("Pièce", "MIRVAE.NPIEC"),
               date("Date", "MIRVAE.DTOPE"),
               text("Journal", "MIRVAE.NUMJL"),
               text("Libellé", "MIRVAE.INPIE")};
  if (!k.lines) l.heading.push_back(text(k.account, "MIRVAE.NUMCP"));
  if (k.dueDate) l.heading.push_back(date("Échéance", "MIRVAE.DTECH"));
  l.heading.push_back(text("Devise", "MIRVAE.MONNAIE_IDENT"));
  if (!k.lines) l.address = {"VNOM", "VADRESSE", "VADRESSE2", "VCPVILLE"};
  l.columns = {text("Compte", "MIRVAL.NUMCP", 1),
               text("Intitulé", "VLIBCP", 1.6),
               text("Libellé", "MIRVAL.LIBEC", 2.2)};
  if (k.lines) {
    l.columns.push_back(amount("Débit", "MIRVAL.MTDEBS"));
    l.columns.push_back(amount("Crédit", "MIRVAL.MTCRES"));
    l.totals = {amount("Total débit", "MIRVAE.DEBPIS"), amount("Total crédit", "MIRVAE.CREPIS")};
    return l;
  }
  l.columns.push_back(
      Zone{.title = "TVA %", .name = "MIRVAL.TXTVA", .format = Format::rate, .width = 0.7, .total = false});
  l.columns.push_back(amount("HT", "MIRVAL.HT"));
  l.columns.push_back(amount("TVA", "MIRVAL.TVA"));
  l.columns.push_back(amount("TTC", "MIRVAL.TTC"));
  l.vat = model::VatBreakdown{.rate = "MIRVAL.TXTVA", .base = "MIRVAL.HT", .vat = "MIRVAL.TVA"};
  l.totals = {amount("Total HT", "MIRVAE.HT"), amount("Total TVA", "MIRVAE.TVA"), amount("Total TTC", "MIRVAE.TTC")};
  return l;
}

Layout listOf(const KindPrint& k) {
  Layout l = titled(k.list, false);
  l.heading = {text("Du", "VDATEMIN"), text("Au", "VDATEMAX")};
  if (!k.lines) {
    l.heading.push_back(text(k.account, "VNUMCP"));
    l.heading.push_back(text("Intitulé", "VLIBCP"));
  }
  if (k.treasury) l.heading.push_back(text("Sens", "VTYPE"));
  l.columns = {date("Date", "MIRVAE.DTOPE", 1.05),
               text("Pièce", "MIRVAE.NPIEC", 0.9)};
  if (k.lines) {
    l.columns.push_back(text("Journal", "MIRVAE.NUMJL", 0.6));
    l.columns.push_back(text("Libellé", "MIRVAE.INPIE", 3));
    l.columns.push_back(amount("Débit", "MIRVAE.DEBPIS"));
    l.columns.push_back(amount("Crédit", "MIRVAE.CREPIS"));
    return l;
  }
  l.columns.push_back(text("Compte", "MIRVAE.NUMCP", 0.85));
  l.columns.push_back(text("Intitulé", "VLIBCP1", 1.7));
  l.columns.push_back(text("Libellé", "MIRVAE.INPIE", 1.9));
  if (k.treasury) {
    l.columns.push_back(text("Sens", "VTYPE_DR", 1.1));
    l.columns.push_back(amount("HT", "VHT"));
    l.columns.push_back(amount("TVA", "VTVA"));
    l.columns.push_back(amount("TTC", "VTTC"));
  } else {
    l.columns.push_back(amount("HT", "MIRVAE.HT"));
    l.columns.push_back(amount("TVA", "MIRVAE.TVA"));
    l.columns.push_back(amount("TTC", "MIRVAE.TTC"));
  }
  return l;
}

}  // namespace

void registerLayouts() {
  for (const KindPrint& k : kKinds) {
    std::string n = std::to_string(k.number);
    model::registerLayout("MIRVAE-IMPR_FICHE" + n, formOf(k));
    model::registerLayout("MIRVAE-IMPR_LISTE" + n, listOf(k));
  }
}

}  // namespace printing
