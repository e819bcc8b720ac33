// The client invoice the benchmarks post, and the two roads that write it: typed
// through the entry screen "MIRVAE-GESTION1" as a user would (saved with the dialog's
// "1" and posted through "MIRVAE-CREER_PIECE_FC" and the ledger), or written with raw
// prepared SQLite statements, the same rows in the same pattern of one transaction
// per invoice.
#pragma once

#include <sqlite3.h>

#include <cstdio>
#include <iterator>
#include <string>

#include "host/error.h"
#include "host/event.h"
#include "host/registry.h"
#include "host/session.h"
#include "model/mains.h"

namespace bench {

// Three lines at 20 %: a service (VAT on receipts), goods and charges (VAT on debits).
struct InvoiceLine {
  const char* account;
  const char* ht;
  const char* tva;
  const char* ttc;
  const char* vatAccount;
  const char* cpost;
  const char* ccrit;
};
inline constexpr InvoiceLine kLines[] = {
    {"706000", "100", "20", "120", "445800", "PROD", "ATEL"},
    {"707000", "250.5", "50.1", "300.6", "445711", "PROD", "ATEL"},
    {"708500", "12.35", "2.47", "14.82", "445711", "", ""},
};
inline constexpr const char* kClient = "411001";
inline constexpr const char* kClientLabel = "Brasserie Lissandre";
inline constexpr const char* kDay = "14/03/2024";
inline constexpr const char* kIsoDay = "2024-03-14";
inline constexpr const char* kTotalHt = "362.85";
inline constexpr const char* kTotalTva = "72.57";
inline constexpr const char* kTotalTtc = "435.42";

// Types one invoice into a new entry screen and saves it; the screen is closed
// afterwards, unless `onOpenScreen`: then the invoice is typed on the entry screen in
// front, opened if there is none, and left open (the save answered "2" starts the
// next one there). Throws HostError naming the step that was refused, with what the
// user saw: a benchmark must never count an invoice that was not saved.
inline void typeInvoice(host::Session& session, bool onOpenScreen = false) {
  auto must = [&](bool accepted, const char* step) {
    if (!accepted) throw host::HostError(std::string("saisie refusée : ") + step + "\n" + session.transcript().rendu());
  };
  if (!onOpenScreen || !session.ecran("MIRVAE-GESTION1"))
    must(model::ouvrir(session, "MIRVAE-GESTION1"), "ouverture de MIRVAE-GESTION1");
  must(model::saisir(session, "VLIBCP1", kClientLabel), "client");
  must(model::saisir(session, "MIRVAE.DTOPE", kDay), "date");
  for (const InvoiceLine& line : kLines) {
    must(model::nouvelleLigne(session), "nouvelle ligne");
    must(model::saisir(session, "LST_MIRVAL.NUMCP", line.account), "compte de la ligne");
    must(model::saisir(session, "LST_V_HT", line.ht), "montant de la ligne");
    must(model::validerLigne(session), "validation de la ligne");
  }
  must(model::appuyer(session, "B_VALID_DOC"), "enregistrement");
  if (!onOpenScreen) model::fermer(session);
  // What the user saw is kept by the session; the benchmark does not read it.
}

// The same rows as the screen and the ledger write for one invoice (header, lines,
// piece, movements, due date), with raw prepared statements on the session's own
// connection, one transaction an invoice, each forced to the disk (synchronous FULL):
// the least a program that keeps every invoice it confirms could do.
class RawWriter {
 public:
  explicit RawWriter(sqlite3* db) : db_(db) {
    exec("PRAGMA synchronous = FULL");
    pieceCounter_ = prepare(
        "INSERT INTO NUMPI (NUMJL, CLE, NUMERO) VALUES ('VT', '202403', 1) "
        "ON CONFLICT (NUMJL, CLE) DO UPDATE SET NUMERO = NUMERO + 1");
    identCounter_ = prepare(
        "INSERT INTO NDOC (NOM, DERNIER) VALUES ('MIRVAL', 1) ON CONFLICT (NOM) DO UPDATE SET DERNIER = DERNIER + 1");
    header_ = prepare(
        "INSERT INTO MIRVAE (IDENT, TYPE, DTOPE, NUMCP, NUMJL, NPIEC, INPIE, NPIES, MONNAIE_IDENT, COURS, DTECH, "
        "SAISIE_MTT, HT, TVA, TTC, DATEC, HEUREC, USERM) VALUES (?1, 'FC', ?2, ?3, 'VT', ?4, ?5, ?6, 'EUR', 1, ?2, "
        "'1', ?7, ?8, ?9, '2024-03-15', '10:30:00', 'banc')");
    line_ = prepare(
        "INSERT INTO MIRVAL (IDENT, NUMERO, NUMCP, COTVA, TXTVA, HT, TVA, TTC, CPOST, CCRIT, MOUVE_UNIQ) "
        "VALUES (?1, ?2, ?3, 'V20', 20, ?4, ?5, ?6, ?7, ?8, ?9)");
    piece_ = prepare(
        "INSERT INTO PIECE (NPIES, NINST, NPIEC, NIPIE, NUMJL, DTOPE, DTPIE, INPIE, LIBPI, CORIG, MONNAIE_IDENT, "
        "COURS, DTCRE) VALUES (?1, ?2, ?3, ?4, 'VT', ?5, ?5, ?6, ?6, '*COMPTA*', 'EUR', 1, '2024-03-15')");
    movement_ = prepare(
        "INSERT INTO MOUVE (UNIQ, NPIES, NLIGS, NUMCP, NUMJL, DTOPE, LIBEC, COTVA, CPOST, CCRIT, MONNAIE_IDENT, "
        "MTDEBS, MTCRES, MTDEB, MTCRE, INDX2) VALUES (?1, ?2, ?3, ?4, 'VT', ?5, ?6, ?7, ?8, ?9, 'EUR', ?10, ?11, "
        "?10, ?11, ?12)");
    due_ = prepare(
        "INSERT INTO ECHEA (NUSYS, UNIQ, NPIES, INDX1, DTECH, CTYPR, NJLTR, CTYEC, BPECH, MTECH, MTECHS, MTRES, "
        "MTRESS) VALUES (?1, ?2, ?3, ?4, ?5, '30FM', 'BQ1', 'FACT', 'VIR', ?6, ?6, ?6, ?6)");
  }
  ~RawWriter() {
    sqlite3_exec(db_, "PRAGMA synchronous = NORMAL", nullptr, nullptr, nullptr);
    for (sqlite3_stmt* s : {pieceCounter_, identCounter_, header_, line_, piece_, movement_, due_})
      sqlite3_finalize(s);
  }
  RawWriter(const RawWriter&) = delete;
  RawWriter& operator=(const RawWriter&) = delete;

  // Writes invoice number n (from 1).
  void write(long long n) {
    char ident[24], npies[24], npiec[24], label[64], nligs[32], unique[24];
    std::snprintf(ident, sizeof ident, "%08lld", n);
    std::snprintf(npies, sizeof npies, "%011lld", n);
    std::snprintf(npiec, sizeof npiec, "VT%lld", n);
    std::snprintf(label, sizeof label, "Facture client n° VT%lld", n);
    exec("BEGIN IMMEDIATE");
    // The counters the screens move: the piece number, each line's identifier.
    run(pieceCounter_);
    for (std::size_t i = 0; i < std::size(kLines); ++i) run(identCounter_);
    long long uniq = (n - 1) * 7;
    auto movement = [&](int order, const char* account, const char* cotva, const char* cpost, const char* ccrit,
                        const char* debit, const char* credit) {
      std::snprintf(nligs, sizeof nligs, "%s%04d", npies, order);
      std::string indx2 = std::string(account) + "|" + kIsoDay;
      bind(movement_, 1, uniq + order);
      bind(movement_, 2, npies);
      bind(movement_, 3, nligs);
      bind(movement_, 4, account);
      bind(movement_, 5, kIsoDay);
      bind(movement_, 6, label);
      bind(movement_, 7, cotva);
      bind(movement_, 8, cpost);
      bind(movement_, 9, ccrit);
      bind(movement_, 10, debit);
      bind(movement_, 11, credit);
      bind(movement_, 12, indx2.c_str());
      run(movement_);
    };
    bind(header_, 1, ident);
    bind(header_, 2, kIsoDay);
    bind(header_, 3, kClient);
    bind(header_, 4, npiec);
    bind(header_, 5, label);
    bind(header_, 6, npies);
    bind(header_, 7, kTotalHt);
    bind(header_, 8, kTotalTva);
    bind(header_, 9, kTotalTtc);
    run(header_);
    int order = 0;
    for (const InvoiceLine& l : kLines) {
      std::snprintf(unique, sizeof unique, "%08lld", (n - 1) * 3 + order / 2 + 1);
      char numero[40];
      std::snprintf(numero, sizeof numero, "%s|%06d", ident, order / 2 + 1);
      bind(line_, 1, unique);
      bind(line_, 2, numero);
      bind(line_, 3, l.account);
      bind(line_, 4, l.ht);
      bind(line_, 5, l.tva);
      bind(line_, 6, l.ttc);
      bind(line_, 7, l.cpost);
      bind(line_, 8, l.ccrit);
      bind(line_, 9, uniq + order + 1);
      run(line_);
      movement(++order, l.account, "V20", l.cpost, l.ccrit, "0", l.ht);
      movement(++order, l.vatAccount, "", "", "", "0", l.tva);
    }
    movement(++order, kClient, "", "", "", kTotalTtc, "0");
    bind(piece_, 1, npies);
    bind(piece_, 2, ident);
    bind(piece_, 3, npiec);
    bind(piece_, 4, n);
    bind(piece_, 5, kIsoDay);
    bind(piece_, 6, label);
    run(piece_);
    std::snprintf(unique, sizeof unique, "%lld", uniq + order);
    bind(due_, 1, n);
    bind(due_, 2, uniq + order);
    bind(due_, 3, npies);
    bind(due_, 4, unique);
    bind(due_, 5, kIsoDay);
    bind(due_, 6, kTotalTtc);
    run(due_);
    exec("COMMIT");
  }

 private:
  sqlite3_stmt* prepare(const char* sql) {
    sqlite3_stmt* s = nullptr;
    if (sqlite3_prepare_v2(db_, sql, -1, &s, nullptr) != SQLITE_OK) fail(sql);
    return s;
  }
  void bind(sqlite3_stmt* s, int i, const char* text) {
    if (sqlite3_bind_text(s, i, text, -1, SQLITE_STATIC) != SQLITE_OK) fail("bind");
  }
  void bind(sqlite3_stmt* s, int i, long long n) {
    if (sqlite3_bind_int64(s, i, n) != SQLITE_OK) fail("bind");
  }
  void run(sqlite3_stmt* s) {
    if (sqlite3_step(s) != SQLITE_DONE) fail(sqlite3_sql(s));
    sqlite3_reset(s);
  }
  void exec(const char* sql) {
    if (sqlite3_exec(db_, sql, nullptr, nullptr, nullptr) != SQLITE_OK) fail(sql);
  }
  [[noreturn]] void fail(const char* what) {
    throw host::HostError(std::string("écriture brute « ") + what + " » : " + sqlite3_errmsg(db_));
  }

  sqlite3* db_;
  sqlite3_stmt* pieceCounter_ = nullptr;
  sqlite3_stmt* identCounter_ = nullptr;
  sqlite3_stmt* header_ = nullptr;
  sqlite3_stmt* line_ = nullptr;
  sqlite3_stmt* piece_ = nullptr;
  sqlite3_stmt* movement_ = nullptr;
  sqlite3_stmt* due_ = nullptr;
};

// Saved but unposted invoices 1..count, as the entry screen leaves them (header and
// three lines), made with raw SQL in one transaction: the start of the cheapest road
// that still goes through the posting process and the ledger.
inline void writeSavedInvoices(host::Database& db, long long count) {
  db.begin();
  host::Statement& headers = db.prepare(R"(
    WITH RECURSIVE n(i) AS (SELECT 1 UNION ALL SELECT i + 1 FROM n WHERE i < ?1)
    INSERT INTO MIRVAE (IDENT, TYPE, DTOPE, NUMCP, NUMJL, NPIEC, INPIE, MONNAIE_IDENT, COURS, DTECH, SAISIE_MTT,
                        HT, TVA, TTC, DATEC, HEUREC, USERM)
    SELECT printf('%08d', i), 'FC', ?2, ?3, 'VT', 'VT' || i, 'Facture client n° VT' || i, 'EUR', 1, ?2, '1',
           ?4, ?5, ?6, '2024-03-15', '10:30:00', 'banc' FROM n)");
  headers.bind(1, count).bind(2, kIsoDay).bind(3, kClient).bind(4, kTotalHt).bind(5, kTotalTva).bind(6, kTotalTtc);
  headers.step();
  headers.reset();
  int order = 0;
  for (const InvoiceLine& l : kLines) {
    ++order;
    host::Statement& lines = db.prepare(R"(
      WITH RECURSIVE n(i) AS (SELECT 1 UNION ALL SELECT i + 1 FROM n WHERE i < ?1)
      INSERT INTO MIRVAL (IDENT, NUMERO, NUMCP, COTVA, TXTVA, HT, TVA, TTC, CPOST, CCRIT)
      SELECT printf('%08d', (i - 1) * 3 + ?2), printf('%08d|%06d', i, ?2), ?3, 'V20', 20, ?4, ?5, ?6, ?7, ?8
      FROM n)");
    lines.bind(1, count).bind(2, static_cast<long long>(order)).bind(3, l.account).bind(4, l.ht).bind(5, l.tva);
    lines.bind(6, l.ttc).bind(7, l.cpost).bind(8, l.ccrit);
    lines.step();
    lines.reset();
  }
  db.commit();
}

// Posts saved invoice n through "MIRVAE-CREER_PIECE_FC" as one user action, as the
// entry screen does after a save.
inline void postSavedInvoice(host::Session& session, long long n) {
  char ident[24];
  std::snprintf(ident, sizeof ident, "%08lld", n);
  host::EvtParamVal launch(1, std::string(ident));
  bool done = session.action(
      [&] { session.executer(host::Registre::instance().creer("MIRVAE-CREER_PIECE_FC", &launch)); });
  if (!done) throw host::HostError(std::string("comptabilisation de l'opération ") + ident + " en échec");
}

// What a dossier holds after `n` invoices, in one line that both roads must give:
// rows of each table and the ledger's total debit and credit.
inline std::string ledgerSummary(host::Session& session) {
  host::Statement& s = session.base().prepare(
      "SELECT (SELECT count(*) FROM MIRVAE WHERE NPIES <> ''), (SELECT count(*) FROM MIRVAL), "
      "(SELECT count(*) FROM PIECE), (SELECT count(*) FROM MOUVE), (SELECT count(*) FROM ECHEA), "
      "(SELECT printf('%.2f', total(MTDEB)) FROM MOUVE), (SELECT printf('%.2f', total(MTCRE)) FROM MOUVE)");
  s.step();
  std::string out = "posted headers " + s.text(0) + ", lines " + s.text(1) + ", pieces " + s.text(2) +
                    ", movements " + s.text(3) + ", due dates " + s.text(4) + ", debit " + s.text(5) + ", credit " +
                    s.text(6);
  s.reset();
  return out;
}

}  // namespace bench
