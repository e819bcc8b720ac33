#include "services/ledger.h"

#include <unistd.h>

#include <atomic>
#include <memory>
#include <string>

#include "host/automate.h"
#include "host/clock.h"
#include "host/error.h"
#include "host/session.h"
#include "services/sql.h"

namespace services {

namespace {

// A piece's movements are those whose NLIGS starts with its 11-character number and
// goes on with digits: this range holds them all and uses the NLIGS index.
constexpr const char* kMovementsOfPiece = "SELECT \"UNIQ\" FROM \"MOUVE\" WHERE \"NLIGS\" >= ?1 AND \"NLIGS\" < ?1 || '~'";

// Why the ledger will not let `npies` go, for a process known as `owner`; 0 when it may.
int refusal(host::Database& db, const std::string& npies, const std::string& owner) {
  if (!scalar(db, "SELECT 1 FROM \"PIECE\" WHERE \"NPIES\" = ?", npies)) return kUnknownPiece;
  if (scalar(db, "SELECT 1 FROM \"PIECE_RESERVEE\" WHERE \"NPIES\" = ? AND \"PROPRIETAIRE\" <> ?", npies, owner))
    return kHeldByAnother;
  if (scalar(db, "SELECT 1 FROM \"PIECE\" WHERE \"NPIES\" = ? AND \"IMPUT\" = 'O'", npies)) return kFinal;
  if (scalar(db,
             std::string("SELECT 1 FROM \"MOUVE\" WHERE \"UNIQ\" IN (") + kMovementsOfPiece +
                 ") AND (\"RELET\" <> '' OR \"RRAPB\" <> '')",
             npies))
    return kMatched;
  if (scalar(db, std::string("SELECT 1 FROM \"ECHEA\" WHERE \"UNIQ\" IN (") + kMovementsOfPiece + ") AND \"UNIQR\" <> 0",
             npies))
    return kSettled;
  return 0;
}

// Names the process in PIECE_RESERVEE: the user, the program and one session of it.
std::string ownerName() {
  static std::atomic<int> sessions{0};
  return host::Session::courante().utilisateur() + "@" + std::to_string(::getpid()) + "#" +
         std::to_string(++sessions);
}

}  // namespace

void ajouterProceduresPieces(host::Automate& library) {
  auto owner = std::make_shared<std::string>(ownerName());
  host::Automate* self = &library;

  library.addBranch("RESERVER_SUPPR_PIECE", [self, owner](host::Evt* e) {
    host::Donnee& flag = e->parametre(0);
    flag = 1;  // until the piece is known to be free
    std::string npies = e->parametre(1).chaine();
    host::Database& db = self->session().base();
    int reason = refusal(db, npies, *owner);
    if (reason == 0)
      execute(db,
              "INSERT OR IGNORE INTO \"PIECE_RESERVEE\" (\"NPIES\", \"PROPRIETAIRE\", \"DTRES\") VALUES (?, ?, ?)",
              npies, *owner, host::jourIso(host::clock::today()) + " " + host::clock::timeOfDay());
    flag = reason;
    self->erreurMethode(0, e);
  });

  library.addBranch("SUPPRIMER_PIECE", [self, owner](host::Evt* e) {
    std::string npies = e->parametre(0).chaine();
    e->parametre(1);  // the trace flag: the ledger keeps no trace of a removed piece
    self->erreurMethode(1, e);
    host::Database& db = self->session().base();
    if (!scalar(db, "SELECT 1 FROM \"PIECE_RESERVEE\" WHERE \"NPIES\" = ? AND \"PROPRIETAIRE\" = ?", npies, *owner))
      return;  // removed only under this process's own reservation
    if (refusal(db, npies, *owner) != 0) return;
    execute(db, std::string("DELETE FROM \"VTSEC\" WHERE \"MOUVE_UNIQ\" IN (") + kMovementsOfPiece + ")", npies);
    execute(db, std::string("DELETE FROM \"ECHEA\" WHERE \"UNIQ\" IN (") + kMovementsOfPiece + ")", npies);
    execute(db, "DELETE FROM \"MOUVE\" WHERE \"NLIGS\" >= ?1 AND \"NLIGS\" < ?1 || '~'", npies);
    execute(db, "DELETE FROM \"PIECE\" WHERE \"NPIES\" = ?", npies);
    db.forcer();
    self->erreurMethode(0, e);
  });

  library.addBranch("LIBERER_SUPPR_PIECE", [self, owner](host::Evt* e) {
    execute(self->session().base(), "DELETE FROM \"PIECE_RESERVEE\" WHERE \"PROPRIETAIRE\" = ?", *owner);
    self->erreurMethode(0, e);
  });
}

}  // namespace services
