#include "services/cppiece.h"

#include <map>
#include <optional>
#include <string>
#include <vector>

#include "host/automate.h"
#include "host/clock.h"
#include "host/counter.h"
#include "host/currency.h"
#include "host/database.h"
#include "host/decimal.h"
#include "host/error.h"
#include "host/registry.h"
#include "host/session.h"
#include "host/snapshot.h"
#include "host/text.h"
#include "host/value.h"
#include "services/sql.h"

namespace services {

using host::Database;
using host::Decimal;
using host::Evt;
using host::Jour;

ImportTestHooks& importTestHooks() {
  static ImportTestHooks hooks;
  return hooks;
}

namespace {

constexpr const char* kModuleName = "CPPIECE-INTERFACE";
constexpr int kPieceNumberWidth = 11;
constexpr int kLineNumberWidth = 4;
constexpr std::size_t kMaxMovements = 9999;
constexpr int kInstanceNumberWidth = 8;
constexpr const char* kTransferTables[] = {"PIECE_IMM", "MOUVE_IMM", "ECHEA_IMM", "VTSEC_IMM"};

std::string padded(long long n, int width) {
  std::string digits = std::to_string(n);
  return digits.size() >= static_cast<std::size_t>(width) ? digits
                                                          : std::string(width - digits.size(), '0') + digits;
}

struct Allocation {
  std::string section;
  Decimal debit, credit;
};

struct DueDate {
  Jour date;
  std::string terms, journal, type, method;
  Decimal amount, keepingAmount;
};

struct Movement {
  long long uniq = 0;
  std::string account, label, vatCode, post, key;
  Decimal debit, credit;                // in the piece's currency, as sent
  Decimal keepingDebit, keepingCredit;  // in the keeping currency, once valued
  std::vector<Allocation> allocations;
  std::vector<DueDate> dueDates;
};

struct Piece {
  std::string npies, journal, entry, number, label, currency, origin;
  Jour date;
  double rate = 0;
  std::vector<Movement> movements;
  bool movementOpen = false;
};

// The rates a piece is valued at, in units for one euro: its own rate for a floating
// currency (the dossier's rate of its day when it gave none), the parity of a fixed
// one; and the keeping currency's. Throws HostError when one of them is not known.
struct Rates {
  Decimal piece, keeping;
};
Rates ratesOf(const Piece& piece, const std::string& keeping) {
  host::Devises& devises = host::euro();
  bool own = !devises.estCoursFixe(piece.currency) && piece.rate > 0;
  return {own ? Decimal::fromDouble(piece.rate) : devises.cours(piece.currency, piece.date),
          devises.cours(keeping, piece.date)};
}

// Values an accepted piece in the keeping currency, each amount rounded to its
// decimals. Rounding may leave the sides a few units apart: the side that falls short
// takes the difference on its largest movement, so that the piece balances there too.
void value(Piece& piece, const std::string& keeping) {
  if (piece.currency == keeping) {
    for (Movement& m : piece.movements) {
      m.keepingDebit = m.debit;
      m.keepingCredit = m.credit;
      for (DueDate& d : m.dueDates) d.keepingAmount = d.amount;
    }
    return;
  }
  Rates rates = ratesOf(piece, keeping);
  auto convert = [&](const Decimal& amount) {
    return host::euro().reprice(amount, rates.piece, rates.keeping, keeping);
  };
  Decimal gap;  // debits minus credits
  for (Movement& m : piece.movements) {
    m.keepingDebit = convert(m.debit);
    m.keepingCredit = convert(m.credit);
    for (DueDate& d : m.dueDates) d.keepingAmount = convert(d.amount);
    gap += m.keepingDebit - m.keepingCredit;
  }
  if (gap.isZero()) return;
  bool creditShort = gap.sign() > 0;
  auto side = [&](Movement& m) -> Decimal& { return creditShort ? m.keepingCredit : m.keepingDebit; };
  Movement* largest = &piece.movements.front();
  for (Movement& m : piece.movements)
    if (side(m).abs() > side(*largest).abs()) largest = &m;
  side(*largest) += gap.abs();
}

// One transfer row, column name -> stored text.
using Row = std::map<std::string, std::string>;

Decimal amountOf(const Row& row, const char* table, const char* column) {
  const std::string& text = row.at(column);
  auto value = Decimal::parse(text);
  if (!value) throw host::HostError("montant « " + text + " » illisible dans " + table + "." + column);
  return *value;
}

Jour dateOf(const Row& row, const char* table, const char* column) {
  const std::string& text = row.at(column);
  auto day = host::lireJour(text);
  if (!day) throw host::HostError("date « " + text + " » illisible dans " + table + "." + column);
  return *day;
}

class PieceImport : public host::Automate {
 public:
  explicit PieceImport(Evt* e) : Automate(e) {
    nomBase("CP");
    addBranch("DEBUT_IMPORT", &PieceImport::debut_import);
    addBranch("DEBUT_PIECE", &PieceImport::debut_piece);
    addBranch("DEBUT_LIGNE", &PieceImport::debut_ligne);
    addBranch("ANALYTIQUE", &PieceImport::analytique);
    addBranch("ECHEANCE", &PieceImport::echeance);
    addBranch("FIN_LIGNE", &PieceImport::fin_ligne);
    addBranch("FIN_PIECE", &PieceImport::fin_piece);
    addBranch("FIN_IMPORT", &PieceImport::fin_import);
    addBranch("POSDEBUT_ERREUR", &PieceImport::posdebut_erreur);
    addBranch("ERREUR_SUIVANTE", &PieceImport::erreur_suivante);
  }

  void debut_import(Evt* e);
  void debut_piece(Evt* e);
  void debut_ligne(Evt* e);
  void analytique(Evt* e);
  void echeance(Evt* e);
  void fin_ligne(Evt* e);
  void fin_piece(Evt* e);
  void fin_import(Evt* e);
  void posdebut_erreur(Evt* e);
  void erreur_suivante(Evt* e);

  void keepState(host::Snapshot& snapshot) override {
    Automate::keepState(snapshot);
    snapshot.keep(instance_, errorCursor_);
  }
  // An instance that the user action leaves open (its caller stopped at a failure, or
  // its piece was refused) is given up with the action: its transfer rows go, and
  // nothing of it is left open in the dossier.
  void endOfUnit() override {
    if (instance_) closeInstance("A");
  }

 private:
  struct Instance {
    std::string ninst;
    std::optional<Piece> piece;
    std::map<std::string, long long> lastRead;  // rowid of the last row read, by table
  };

  Database& db() { return session().base(); }
  bool start(Evt* e);
  void finish(Evt* e, int code) { erreurMethode(code, e); }
  // Records `text` under the open instance and returns `code`.
  int fail(int code, const std::string& text);
  // Checks that a piece (and, when asked, a movement) is open; 0 when it is.
  int requirePiece();
  int requireMovement();
  std::optional<Row> readTransfer(const char* table, const std::vector<const char*>& columns, bool consume = true);
  void closeInstance(const char* state);
  int debutPiece(host::Donnee& npies);
  int debutLigne(Evt* e);
  int finPiece(const std::string& flag);
  std::vector<std::string> faults(const Piece& piece);
  void write(const Piece& piece);

  std::optional<Instance> instance_;
  std::map<std::string, long long> errorCursor_;  // by instance: ORDRE of the last text handed out
};

// ---------------------------------------------------------------------------- helpers

bool PieceImport::start(Evt* e) {
  // Stays the result when the body raises, so that the caller never reads a success.
  erreurMethode(kInternalFailure, e);
  ImportTestHooks& hooks = importTestHooks();
  if (hooks.onCall) {
    std::string account;
    if (e->nom() == "DEBUT_LIGNE" && instance_)
      if (auto row = readTransfer("MOUVE_IMM", {"NUMCP"}, false)) account = row->at("NUMCP");
    hooks.onCall(e->nom(), account);
  }
  if (!hooks.failProcedure.empty() && hooks.failProcedure == e->nom() && ++hooks.seen == hooks.failOccurrence) {
    erreurMethode(hooks.failCode, e);
    return false;
  }
  return true;
}

int PieceImport::fail(int code, const std::string& text) {
  if (!instance_) return code;
  execute(db(),
          "INSERT INTO \"IMPORT_ERREUR\" (\"NINST\", \"ORDRE\", \"CODE\", \"TEXTE\") "
          "SELECT ?1, coalesce(max(\"ORDRE\"), 0) + 1, ?2, ?3 FROM \"IMPORT_ERREUR\" WHERE \"NINST\" = ?1",
          instance_->ninst, static_cast<long long>(code), text);
  return code;
}

int PieceImport::requirePiece() {
  if (!instance_) return kNoInstance;
  if (!instance_->piece) return fail(kPieceState, "Aucune pièce n'est commencée.");
  return kImportOk;
}

int PieceImport::requireMovement() {
  if (int code = requirePiece()) return code;
  if (!instance_->piece->movementOpen) return fail(kMovementState, "Aucun mouvement n'est commencé.");
  return kImportOk;
}

// The row written last into `table` for the open instance, provided it is newer than
// the last one read: a call never consumes the same row twice.
std::optional<Row> PieceImport::readTransfer(const char* table, const std::vector<const char*>& columns,
                                             bool consume) {
  std::string sql = "SELECT ";
  for (const char* c : columns) sql += host::quoteIdent(c) + ", ";
  sql += "rowid FROM " + host::quoteIdent(table) + " WHERE \"NINST\" = ? AND rowid > ? ORDER BY rowid DESC LIMIT 1";
  long long& last = instance_->lastRead[table];
  host::Statement& s = bound(db(), sql, instance_->ninst, last);
  std::optional<Row> row;
  if (s.step()) {
    row.emplace();
    for (std::size_t i = 0; i < columns.size(); ++i) (*row)[columns[i]] = s.text(static_cast<int>(i));
    if (consume) last = s.integer(static_cast<int>(columns.size()));
  }
  s.reset();
  return row;
}

void PieceImport::closeInstance(const char* state) {
  execute(db(), "UPDATE \"IMPORT_INSTANCE\" SET \"ETAT\" = ? WHERE \"NINST\" = ?", state, instance_->ninst);
  for (const char* table : kTransferTables)
    execute(db(), "DELETE FROM " + host::quoteIdent(table) + " WHERE \"NINST\" = ?", instance_->ninst);
  instance_.reset();
}

// ---------------------------------------------------------------------------- the import

void PieceImport::debut_import(Evt* e) {
  if (!start(e)) return;
  host::Donnee& ninst = e->parametre(0);
  // An instance left open by an import that stopped half-way is given up.
  if (instance_) closeInstance("A");
  host::UsedNumbers used{.table = "IMPORT_INSTANCE", .column = "NINST", .width = kInstanceNumberWidth};
  std::string number = host::nextNumberText(db(), "IMPORT_INSTANCE", kInstanceNumberWidth, used);
  execute(db(), "INSERT INTO \"IMPORT_INSTANCE\" (\"NINST\", \"ETAT\", \"DTCRE\") VALUES (?, 'O', ?)", number,
          host::jourIso(host::clock::today()));
  instance_ = Instance{number, std::nullopt, {}};
  ninst = number;
  finish(e, kImportOk);
}

void PieceImport::debut_piece(Evt* e) {
  if (!start(e)) return;
  finish(e, debutPiece(e->parametre(0)));
}

int PieceImport::debutPiece(host::Donnee& npies) {
  if (!instance_) return kNoInstance;
  if (instance_->piece) return fail(kPieceState, "La pièce " + instance_->piece->npies + " n'est pas terminée.");
  auto row = readTransfer("PIECE_IMM",
                          {"NUMJL", "DTOPE", "NSAIS", "NPIEC", "INPIE", "MONNAIE_IDENT", "COURS", "CORIG"});
  if (!row) return fail(kMissingRow, "Aucun en-tête de pièce n'a été transmis.");
  Piece piece;
  piece.journal = row->at("NUMJL");
  piece.date = dateOf(*row, "PIECE_IMM", "DTOPE");
  piece.entry = row->at("NSAIS");
  piece.number = row->at("NPIEC");
  piece.label = row->at("INPIE");
  piece.currency = row->at("MONNAIE_IDENT");
  piece.rate = row->at("COURS").empty() ? 0 : std::stod(row->at("COURS"));
  piece.origin = row->at("CORIG");
  host::UsedNumbers used{.table = "PIECE", .column = "NPIES", .width = kPieceNumberWidth};
  piece.npies = host::nextNumberText(db(), "PIECE", kPieceNumberWidth, used);
  npies = piece.npies;
  instance_->piece = std::move(piece);
  return kImportOk;
}

void PieceImport::debut_ligne(Evt* e) {
  if (!start(e)) return;
  finish(e, debutLigne(e));
}

int PieceImport::debutLigne(Evt* e) {
  if (int code = requirePiece()) return code;
  Piece& piece = *instance_->piece;
  if (piece.movementOpen) return fail(kMovementState, "Le mouvement précédent n'est pas terminé.");
  auto row = readTransfer("MOUVE_IMM", {"NUMCP", "LIBEC", "MTDEB", "MTCRE", "COTVA", "CPOST", "CCRIT"});
  if (!row) return fail(kMissingRow, "Aucun mouvement n'a été transmis.");
  Movement m;
  m.account = row->at("NUMCP");
  m.label = row->at("LIBEC");
  m.debit = amountOf(*row, "MOUVE_IMM", "MTDEB");
  m.credit = amountOf(*row, "MOUVE_IMM", "MTCRE");
  m.vatCode = row->at("COTVA");
  m.post = row->at("CPOST");
  m.key = row->at("CCRIT");
  m.uniq = host::nextNumber(db(), "MOUVE", host::UsedNumbers{.table = "MOUVE", .column = "UNIQ"});
  if (e->nbParams() > 0) e->parametre(0) = host::Valeur::entier(m.uniq);
  piece.movements.push_back(std::move(m));
  piece.movementOpen = true;
  return kImportOk;
}

void PieceImport::analytique(Evt* e) {
  if (!start(e)) return;
  if (int code = requireMovement()) return finish(e, code);
  auto row = readTransfer("VTSEC_IMM", {"CSECT", "MTADE", "MTACR"});
  if (!row) return finish(e, fail(kMissingRow, "Aucune ligne analytique n'a été transmise."));
  instance_->piece->movements.back().allocations.push_back(
      {row->at("CSECT"), amountOf(*row, "VTSEC_IMM", "MTADE"), amountOf(*row, "VTSEC_IMM", "MTACR")});
  finish(e, kImportOk);
}

void PieceImport::echeance(Evt* e) {
  if (!start(e)) return;
  if (int code = requireMovement()) return finish(e, code);
  auto row = readTransfer("ECHEA_IMM", {"DTECH", "CTYPR", "NJLTR", "CTYEC", "MTECH", "BPECH"});
  if (!row) return finish(e, fail(kMissingRow, "Aucune échéance n'a été transmise."));
  instance_->piece->movements.back().dueDates.push_back({dateOf(*row, "ECHEA_IMM", "DTECH"), row->at("CTYPR"),
                                                         row->at("NJLTR"), row->at("CTYEC"),
                                                         row->at("BPECH"), amountOf(*row, "ECHEA_IMM", "MTECH"),
                                                         Decimal()});
  finish(e, kImportOk);
}

void PieceImport::fin_ligne(Evt* e) {
  if (!start(e)) return;
  if (int code = requireMovement()) return finish(e, code);
  instance_->piece->movementOpen = false;
  finish(e, kImportOk);
}

void PieceImport::fin_piece(Evt* e) {
  if (!start(e)) return;
  finish(e, finPiece(e->parametre(0).chaine()));
}

int PieceImport::finPiece(const std::string& flag) {
  if (int code = requirePiece()) return code;
  if (flag != "O" && flag != "N")
    return fail(kBadParameter, "Fin de pièce : option « " + flag + " » inconnue (« O » ou « N »).");
  // Whatever happens now, the piece is over: it is recorded whole or not at all.
  Piece piece = std::move(*instance_->piece);
  instance_->piece.reset();
  if (flag == "N") return kImportOk;
  if (piece.movementOpen)
    return fail(kMovementState, "Le dernier mouvement de la pièce " + piece.npies + " n'est pas terminé.");
  std::vector<std::string> found = faults(piece);
  if (!found.empty()) {
    for (const auto& text : found) fail(kPieceRefused, text);
    return kPieceRefused;
  }
  try {
    value(piece, host::euro().tenue());
    write(piece);
    db().forcer();
  } catch (const host::HostError& error) {
    return fail(kPieceRefused, "La pièce n'a pu être écrite : " + std::string(error.what()));
  }
  return kImportOk;
}

void PieceImport::fin_import(Evt* e) {
  if (!start(e)) return;
  if (!instance_) return finish(e, kNoInstance);
  int code = kImportOk;
  if (instance_->piece)
    code = fail(kPieceState, "La pièce " + instance_->piece->npies + " n'a pas été terminée : elle est abandonnée.");
  closeInstance("F");
  finish(e, code);
}

// ---------------------------------------------------------------------------- error texts

void PieceImport::posdebut_erreur(Evt* e) {
  if (!start(e)) return;
  std::string ninst = e->parametre(0).chaine();
  if (!scalar(db(), "SELECT 1 FROM \"IMPORT_INSTANCE\" WHERE \"NINST\" = ?", ninst))
    return finish(e, kUnknownInstance);
  errorCursor_[ninst] = 0;
  finish(e, kImportOk);
}

void PieceImport::erreur_suivante(Evt* e) {
  if (!start(e)) return;
  long long code = e->parametre(0).entier();
  host::Donnee& text = e->parametre(1);
  std::string ninst = e->parametre(2).chaine();
  text = "";
  if (!scalar(db(), "SELECT 1 FROM \"IMPORT_INSTANCE\" WHERE \"NINST\" = ?", ninst))
    return finish(e, kUnknownInstance);
  long long& cursor = errorCursor_[ninst];
  host::Statement& s = bound(db(),
                             "SELECT \"ORDRE\", \"TEXTE\" FROM \"IMPORT_ERREUR\" WHERE \"NINST\" = ? AND \"CODE\" = ? "
                             "AND \"ORDRE\" > ? ORDER BY \"ORDRE\" LIMIT 1",
                             ninst, code, cursor);
  if (s.step()) {
    cursor = s.integer(0);
    text = s.text(1);
  }
  s.reset();
  finish(e, kImportOk);
}

// ---------------------------------------------------------------------------- the ledger's judgement

// Every reason why the ledger cannot take the piece, in French, for the user. This is
// the one place where a piece is judged, its balance included.
std::vector<std::string> PieceImport::faults(const Piece& piece) {
  std::vector<std::string> out;
  host::Statement& param = db().prepare(
      "SELECT \"PDDEX\", \"PDTCL\", \"MONNAIE_IDENT\" FROM \"PARAM\" WHERE \"PNUME\" = 1");
  if (!param.step()) {
    param.reset();
    return {"Les paramètres du dossier sont introuvables."};
  }
  std::string firstDay = param.text(0), lastDay = param.text(1), keeping = param.text(2);
  param.reset();

  std::optional<std::string> closedUntil;
  if (piece.journal.empty()) {
    out.push_back("Le journal de la pièce est absent.");
  } else {
    closedUntil = scalar(db(), "SELECT \"CLOAM\" FROM \"JONAL\" WHERE \"NUMJL\" = ?", piece.journal);
    if (!closedUntil) out.push_back("Le journal « " + piece.journal + " » n'existe pas.");
  }

  if (!piece.date) {
    out.push_back("La date de la pièce est absente.");
  } else {
    std::string iso = host::jourIso(piece.date), shown = host::jourTexte(piece.date);
    if (!firstDay.empty() && iso < firstDay)
      out.push_back("La date du " + shown + " précède le début de l'exercice (" +
                    host::jourTexte(*host::lireJour(firstDay)) + ").");
    if (!lastDay.empty() && iso > lastDay)
      out.push_back("La date du " + shown + " dépasse la date de clôture de la saisie (" +
                    host::jourTexte(*host::lireJour(lastDay)) + ").");
    std::string month = host::yearMonth(piece.date);
    if (closedUntil && !closedUntil->empty() && month <= *closedUntil)
      out.push_back("La période " + iso.substr(5, 2) + "/" + iso.substr(0, 4) + " est clôturée pour le journal « " +
                    piece.journal + " ».");
  }

  if (piece.currency.empty()) {
    out.push_back("La monnaie de la pièce est absente.");
  } else if (piece.currency != keeping) {
    try {
      ratesOf(piece, keeping);
    } catch (const host::HostError& error) {
      out.push_back("La pièce en " + piece.currency + " ne peut être valorisée en " + keeping + " : " +
                    error.what() + ".");
    }
  }

  if (auto why = host::text::flaw(piece.label)) out.push_back("Le libellé de la pièce est refusé : " + *why + ".");
  if (piece.movements.empty()) out.push_back("La pièce ne contient aucun mouvement.");
  if (piece.movements.size() > kMaxMovements)
    out.push_back("La pièce compte plus de " + std::to_string(kMaxMovements) + " mouvements.");

  Decimal debit, credit;
  for (std::size_t i = 0; i < piece.movements.size(); ++i) {
    const Movement& m = piece.movements[i];
    std::string which = "Mouvement " + std::to_string(i + 1) + " : ";
    if (m.account.empty())
      out.push_back(which + "le compte est absent.");
    else if (!scalar(db(), "SELECT 1 FROM \"COMPT\" WHERE \"NUMCP\" = ?", m.account))
      out.push_back(which + "le compte « " + m.account + " » n'existe pas.");
    if (auto why = host::text::flaw(m.label)) out.push_back(which + "le libellé est refusé : " + *why + ".");
    if (!m.allocations.empty()) {
      // The analytic rows spread the movement itself: on its side, to the cent.
      Decimal spreadDebit, spreadCredit;
      for (const Allocation& a : m.allocations) {
        spreadDebit += a.debit;
        spreadCredit += a.credit;
      }
      if (spreadDebit != m.debit || spreadCredit != m.credit)
        out.push_back(which + "la ventilation analytique (débit " + spreadDebit.toString(2) + ", crédit " +
                      spreadCredit.toString(2) + ") ne totalise pas le mouvement (débit " + m.debit.toString(2) +
                      ", crédit " + m.credit.toString(2) + ").");
    }
    debit += m.debit;
    credit += m.credit;
  }
  if (debit != credit)
    out.push_back("La pièce n'est pas équilibrée : débit " + debit.toString(2) + ", crédit " + credit.toString(2) +
                  ".");
  return out;
}

// Writes an accepted piece; a failure half-way takes back everything it wrote.
void PieceImport::write(const Piece& piece) {
  Database& base = db();
  base.exec("SAVEPOINT \"cppiece_fin_piece\"");
  try {
    std::string day = host::jourIso(piece.date);
    execute(base,
            "INSERT INTO \"PIECE\" (\"NPIES\", \"NINST\", \"NPIEC\", \"NIPIE\", \"NUMJL\", \"DTOPE\", \"DTPIE\", "
            "\"INPIE\", \"LIBPI\", \"NSAIS\", \"CORIG\", \"MONNAIE_IDENT\", \"COURS\", \"IMPUT\", \"DTCRE\") "
            "VALUES (?1, ?2, ?3, ?4, ?5, ?6, ?6, ?7, ?7, ?8, ?9, ?10, ?11, '', ?12)",
            piece.npies, instance_->ninst, piece.number, std::stoll(piece.npies), piece.journal, day, piece.label,
            piece.entry, piece.origin, piece.currency, piece.rate, host::jourIso(host::clock::today()));
    for (std::size_t i = 0; i < piece.movements.size(); ++i) {
      const Movement& m = piece.movements[i];

      execute(base,
              "INSERT INTO \"MOUVE\" (\"UNIQ\", \"NPIES\", \"NLIGS\", \"NUMCP\", \"NUMJL\", \"JLNOR\", \"DTOPE\", "
              "\"LIBEC\", \"COTVA\", \"CPOST\", \"CCRIT\", \"MONNAIE_IDENT\", \"MTDEBS\", \"MTCRES\", \"MTDEB\", "
              "\"MTCRE\", \"RELET\", \"RRAPB\", \"INDX2\") "
              "VALUES (?1, ?2, ?3, ?4, ?5, '', ?6, ?7, ?8, ?9, ?10, ?11, ?12, ?13, ?14, ?15, '', '', ?16)",
              m.uniq, piece.npies, piece.npies + padded(static_cast<long long>(i + 1), kLineNumberWidth), m.account,
              piece.journal, day, m.label, m.vatCode, m.post, m.key, piece.currency, m.debit.toString(0),
              m.credit.toString(0), m.keepingDebit.toString(0), m.keepingCredit.toString(0), m.account + "|" + day);
      for (const Allocation& a : m.allocations)
        execute(base,
                "INSERT INTO \"VTSEC\" (\"UNIQ\", \"MOUVE_UNIQ\", \"CSECT\", \"MTADE\", \"MTACR\") "
                "VALUES (?, ?, ?, ?, ?)",
                host::nextNumber(base, "VTSEC", host::UsedNumbers{.table = "VTSEC", .column = "UNIQ"}), m.uniq,
                a.section, a.debit.toString(0), a.credit.toString(0));
      for (const DueDate& d : m.dueDates) {
        std::string amount = d.amount.toString(0), keepingAmount = d.keepingAmount.toString(0);
        execute(base,
                "INSERT INTO \"ECHEA\" (\"NUSYS\", \"UNIQ\", \"NPIES\", \"INDX1\", \"UNIQR\", \"DTECH\", \"CTYPR\", "
                "\"NJLTR\", \"CTYEC\", \"BPECH\", \"MTECH\", \"MTECHS\", \"MTRES\", \"MTRESS\") "
                "VALUES (?1, ?2, ?3, ?4, 0, ?5, ?6, ?7, ?8, ?9, ?10, ?11, ?10, ?11)",
                host::nextNumber(base, "ECHEA", host::UsedNumbers{.table = "ECHEA", .column = "NUSYS"}), m.uniq,
                piece.npies, std::to_string(m.uniq), host::jourIso(d.date), d.terms, d.journal, d.type, d.method,
                keepingAmount, amount);
      }
    }
  } catch (...) {
    base.exec("ROLLBACK TO \"cppiece_fin_piece\"");
    base.exec("RELEASE \"cppiece_fin_piece\"");
    throw;
  }
  base.exec("RELEASE \"cppiece_fin_piece\"");
}

}  // namespace

void chargerGrandLivre() {
  if (host::Registre::instance().module(kModuleName)) return;
  host::Module declaration("", kModuleName, &host::fabriquer<PieceImport>, false, "");
}

}  // namespace services
