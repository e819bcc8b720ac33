#include "posting/supprimer_piece.h"

#include <gtest/gtest.h>

#include <functional>

#include "posting/verifier_modif_piece.h"
#include "tests/posting/posting_fixture.h"
#include "tests/support/library_double.h"

namespace {

using Strings = std::vector<std::string>;

// A posted client invoice with a due date and analytic rows, and the ways the ledger
// may have matched or validated it since.
class PieceProtegeeTest : public testing_support::PostingTest {
 protected:
  void SetUp() override {
    PostingTest::SetUp();
    ecrire({.lignes = {{"706000", "100", "20", "V20", {{"ATELIER", "0", "100"}}}, {"707000", "50"}}});
    poster();
    piece_ = npies();
    ASSERT_EQ(compte("SELECT count(*) FROM PIECE"), 1);
    session().transcript().vider();
  }

  void supprimer(const std::string& number) {
    host::EvtParamVal evt(2, number, "N");
    lancer("MIRVAE-SUPPRIMER_PIECE", evt);
  }

  int verifier(const std::string& number) {
    host::Entier flag(42);
    host::Chaine npies(number);
    host::EvtParamRef evt(2, &flag, &npies);
    lancer("MIRVAE-VERIFIER_MODIF_PIECE", evt);
    return static_cast<int>(flag.entier());
  }

  long long lignesDuGrandLivre() {
    return compte("SELECT (SELECT count(*) FROM PIECE) + (SELECT count(*) FROM MOUVE) + "
                  "(SELECT count(*) FROM ECHEA) + (SELECT count(*) FROM VTSEC)");
  }

  void lettrer() { base().exec("UPDATE MOUVE SET RELET = 'AB' WHERE NUMCP = '411001'"); }
  void pointer() { base().exec("UPDATE MOUVE SET RRAPB = 'R1' WHERE NUMCP = '707000'"); }
  void valider() { base().exec("UPDATE PIECE SET IMPUT = 'O'"); }
  void regler() { base().exec("UPDATE ECHEA SET UNIQR = 77"); }
  void reserverAilleurs() {
    base().exec("INSERT INTO PIECE_RESERVEE (NPIES, PROPRIETAIRE, DTRES) VALUES ('" + piece_ +
                "', 'autre@1#1', '2024-03-15 09:00:00')");
  }

  // Takes back every protection, so that the next case starts from a free piece.
  void deproteger() {
    base().exec("UPDATE PIECE SET IMPUT = ''; UPDATE MOUVE SET RELET = '', RRAPB = ''; "
                "UPDATE ECHEA SET UNIQR = 0; DELETE FROM PIECE_RESERVEE");
  }

  std::string piece_;
  // The ledger's removal procedures, watched: the ledger refuses by itself a removal
  // it did not reserve, which would hide a call that should not have been made.
  testing_support::LibraryDouble ledger_{"COMPTA-MOD_CAL_BIBLIOPROC"};
};

TEST_F(PieceProtegeeTest, DeletionRemovesEveryRowOfThePieceAndItsReservation) {
  ecrire({.ident = "OP000002", .lignes = {{"706000", "10"}}});
  poster("OP000002");
  ledger_.calls.clear();
  supprimer(piece_);
  EXPECT_EQ(ledger_.calls, (Strings{"RESERVER_SUPPR_PIECE", "SUPPRIMER_PIECE", "LIBERER_SUPPR_PIECE"}));
  EXPECT_EQ(compte("SELECT count(*) FROM PIECE WHERE NPIES = '" + piece_ + "'"), 0);
  EXPECT_EQ(compte("SELECT count(*) FROM MOUVE WHERE NPIES = '" + piece_ + "'"), 0);
  EXPECT_EQ(compte("SELECT count(*) FROM ECHEA WHERE NPIES = '" + piece_ + "'"), 0);
  EXPECT_EQ(compte("SELECT count(*) FROM VTSEC"), 0);
  EXPECT_EQ(lignesDuGrandLivre(), 4) << "the other piece stays whole: header, two movements, due date";
  EXPECT_EQ(compte("SELECT count(*) FROM PIECE_RESERVEE"), 0);
  EXPECT_TRUE(messages().empty());

  // The removed piece's number is never handed out again.
  poster();
  EXPECT_GT(npies(), piece_);
}

TEST_F(PieceProtegeeTest, DeletionWithEmptyOrUnknownNumberDoesNothing) {
  long long before = lignesDuGrandLivre();
  supprimer("");
  supprimer("00000009999");
  EXPECT_EQ(lignesDuGrandLivre(), before);
  EXPECT_TRUE(ledger_.calls.empty());
  EXPECT_TRUE(messages().empty());
}

TEST_F(PieceProtegeeTest, RefusedReservationKeepsThePieceWhole) {
  const std::pair<const char*, std::function<void()>> cases[] = {
      {"held by another process", [this] { reserverAilleurs(); }},
      {"validated for good", [this] { valider(); }},
      {"lettered", [this] { lettrer(); }},
      {"reconciled", [this] { pointer(); }},
      {"settled", [this] { regler(); }},
  };
  long long before = lignesDuGrandLivre();
  for (const auto& [name, protect] : cases) {
    SCOPED_TRACE(name);
    protect();
    ledger_.calls.clear();
    supprimer(piece_);
    EXPECT_EQ(ledger_.calls, Strings{"RESERVER_SUPPR_PIECE"}) << "neither removal nor release without a reservation";
    EXPECT_EQ(lignesDuGrandLivre(), before);
    EXPECT_EQ(compte("SELECT count(*) FROM PIECE_RESERVEE WHERE PROPRIETAIRE <> 'autre@1#1'"), 0);
    deproteger();
  }
  EXPECT_TRUE(messages().empty());
}

TEST_F(PieceProtegeeTest, VerificationReportsOnlyTheFirstFailingCheck) {
  const char* final = "Cette pièce est validée définitivement.@La modification est impossible !";
  const char* matched = "Cette pièce contient un mouvement lettré ou pointé.@La modification est impossible !";
  const char* settled = "Cette pièce est totalement ou partiellement réglée.@La modification est impossible !";
  struct Case {
    const char* name;
    std::function<void()> protect;
    std::string number;
    int flag;
    Strings shown;
  } cases[] = {
      {"never posted", [] {}, "", 0, {}},
      {"no longer in the ledger", [] {}, "00000009999", -1, {}},
      {"free", [] {}, piece_, 0, {}},
      {"final and lettered", [this] {
         valider();
         lettrer();
       }, piece_, 1, {final}},
      {"one lettered movement among several", [this] { lettrer(); }, piece_, 1, {matched}},
      {"reconciled and settled", [this] {
         pointer();
         regler();
       }, piece_, 1, {matched}},
      {"partly settled only", [this] { regler(); }, piece_, 1, {settled}},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.name);
    c.protect();
    session().transcript().vider();
    EXPECT_EQ(verifier(c.number), c.flag);
    EXPECT_EQ(messages(), c.shown);
    deproteger();
  }
}

}  // namespace
