#include "access/acces.h"

#include <gtest/gtest.h>

#include "host/currency.h"
#include "host/registry.h"
#include "model/mains.h"
#include "model/traitmnt.h"
#include "registry/operation_kinds.h"
#include "tests/support/fixture.h"

namespace {

using namespace host;
namespace mains = model;

// What the access screen handed to the module it opened.
struct Lancement {
  std::string module, ident, mode;
};
std::vector<Lancement> lancements;

// Stands in for the entry screen of kind N (the piece view for 0): records its
// parameters, ends.
template <int N>
struct Doublure : model::Traitmnt {
  explicit Doublure(Evt* e) : Traitmnt(e) {
    Lancement l{N == 0 ? "VISUECRI" : "MIRVAE-GESTION" + std::to_string(N), "", ""};
    if (e->nbParams() > 0) l.ident = e->parametre(0).chaine();
    if (e->nbParams() > 1) l.mode = e->parametre(1).chaine();
    lancements.push_back(l);
  }
};
constexpr Fabrique kDoublures[] = {&fabriquer<Doublure<0>>, &fabriquer<Doublure<1>>, &fabriquer<Doublure<2>>,
                                   &fabriquer<Doublure<3>>, &fabriquer<Doublure<4>>, &fabriquer<Doublure<5>>,
                                   &fabriquer<Doublure<6>>};

// Each kind's operations, alike: one posted in February, one not posted, one whose
// piece is not yet posted in March, one of the previous exercise whose piece is gone
// (so posted), and one on an account that no longer exists. Bank and cash keep all
// theirs on the account the screen opens on; a miscellaneous operation has none.
struct Sorte {
  int kind;
  const char* account;   // the rows' account
  const char* other;     // the account of the not-posted row
  const char* gone;      // an account the chart does not have
  const char* goneTitle;  // the title its row shows, for the kinds that show one
};
constexpr Sorte kSortes[] = {
    {1, "411001", "411002", "411999", "Client <411999> inexistant !"},
    {2, "401001", "401002", "401999", "Fournisseur <401999> inexistant !"},
    {3, "421001", "401001", "421999", "Tiers <421999> inexistant !"},
    {4, "512100", "512100", "512100", nullptr},
    {5, "530000", "530000", "530000", nullptr},
    {6, "", "", "", nullptr},
};

// IDENT of row `n` of kind `kind`: "k000000n".
std::string ident(int kind, int n) { return std::to_string(kind) + "000000" + std::to_string(n); }

class BrowserTest : public testing_support::DossierTest {
 protected:
  void SetUp() override {
    DossierTest::SetUp();
    lancements.clear();
    for (int kind = 0; kind <= 6; ++kind)
      standIns_.push_back(std::make_unique<testing_support::ModuleStandIn>(
          kind == 0 ? "COMPTA-VISUECRI" : "MIRVAE-GESTION" + std::to_string(kind), kDoublures[kind]));
    for (const Sorte& s : kSortes) {
      const std::string type = registry::operationKind(s.kind).type, k = std::to_string(s.kind);
      auto row = [&](int n, const char* date, const char* account, const char* npies, const char* direction,
                     const char* ttc) {
        base().exec("INSERT INTO MIRVAE (IDENT, TYPE, DTOPE, NUMCP, NPIEC, NPIES, TYPE_DR, HT, TVA, TTC) VALUES ('" +
                    ident(s.kind, n) + "', '" + type + "', '" + date + "', '" + account + "', '" + type + "000" +
                    std::to_string(n) + "', '" + npies + "', '" + direction + "', '" + ttc + "', '0', '" + ttc + "')");
      };
      row(1, "2024-02-05", s.account, ("P" + k + "1").c_str(), "R", "120.00");
      row(2, "2024-02-20", s.other, "", "D", "50.00");
      row(3, "2024-03-02", s.account, ("P" + k + "3").c_str(), "R", "10.00");
      row(5, "2023-12-28", s.account, ("P" + k + "0").c_str(), "R", "1.00");
      row(6, "2024-02-25", s.gone, "", "D", "7.50");
      base().exec("INSERT INTO PIECE (NPIES, IMPUT) VALUES ('P" + k + "1', 'O'), ('P" + k + "3', '')");
    }
  }

  void ouvrirEcran(int kind = 1) { ASSERT_TRUE(mains::ouvrir(session(), "MIRVAE-ACCES" + std::to_string(kind))); }
  std::vector<std::string> idents() {
    std::vector<std::string> out;
    for (const auto& row : mains::lignes(session())) out.push_back(row.at("IDENT"));
    return out;
  }
  // The rows of kind `kind` numbered `ns`, in that order.
  static std::vector<std::string> rows(int kind, std::initializer_list<int> ns) {
    std::vector<std::string> out;
    for (int n : ns) out.push_back(ident(kind, n));
    return out;
  }
  std::string v(const char* object) { return mains::valeur(session(), object); }
  std::string dernierMessage() { return session().transcript().textes("message").back(); }
  std::string libelleCompte(const std::string& numcp) { return sql("SELECT LIBCP FROM COMPT WHERE NUMCP = '" + numcp + "'"); }

  std::vector<std::unique_ptr<testing_support::ModuleStandIn>> standIns_;
};

// ---------------------------------------------------------------------------- every kind

class BrowserKindTest : public BrowserTest, public ::testing::WithParamInterface<Sorte> {
 protected:
  int kind() const { return GetParam().kind; }
};

TEST_P(BrowserKindTest, ListsOnlyItsOwnOperationsByPeriodPostingStateAndPieceWithTheirAccountTitles) {
  const int k = kind();
  const std::string piece = registry::operationKind(k).type + std::string("0002");
  ouvrirEcran(k);
  mains::saisir(session(), "VMOIAN", "");
  EXPECT_EQ(idents(), rows(k, {5, 1, 2, 6, 3}));
  if (GetParam().goneTitle) {
    auto shown = mains::lignes(session());
    EXPECT_EQ(shown[1].at("VLIBCP2"), libelleCompte(GetParam().account));
    EXPECT_EQ(shown[3].at("VLIBCP2"), GetParam().goneTitle);
  }
  struct Step {
    const char* object;
    const char* text;
    std::initializer_list<int> shown;
  } steps[] = {
      {"VIMPUT", "O", {5, 1}},  // the gone piece of the past exercise counts as posted
      {"VIMPUT", "N", {2, 6, 3}},
      {"VIMPUT", "", {5, 1, 2, 6, 3}},
      {"VMOIAN", "02/2024", {1, 2, 6}},
      {"VNPIEC", piece.c_str(), {2}},
      {"VNPIEC_TOUS", "O", {1, 2, 6}},
  };
  for (const Step& step : steps) {
    ASSERT_TRUE(mains::saisir(session(), step.object, step.text)) << step.object << " " << step.text;
    EXPECT_EQ(idents(), rows(k, step.shown)) << step.object << " " << step.text;
  }
}

TEST_P(BrowserKindTest, ActionsOpenItsOwnEntryScreenAndPrintsItsOwnRows) {
  const int k = kind();
  ouvrirEcran(k);
  mains::saisir(session(), "VMOIAN", "02/2024");
  mains::choisirLigne(session(), 1);
  for (const char* action : {"GERER", "MODIFIER", "CREER"}) ASSERT_TRUE(mains::appuyer(session(), action)) << action;
  ASSERT_EQ(lancements.size(), 3u);
  const char* modes[] = {"VMCAv", "VMCAm", "VMCAc"};
  for (int i = 0; i < 3; ++i) {
    EXPECT_EQ(lancements[i].module, "MIRVAE-GESTION" + std::to_string(k));
    EXPECT_EQ(lancements[i].ident, ident(k, 1));
    EXPECT_EQ(lancements[i].mode, modes[i]);
  }
  // The list print is handed the list's own request.
  std::string request = mains::ecranDevant(session()).table(false)->requete();
  for (const std::string& part : {"TYPE = '" + std::string(registry::operationKind(k).type) + "'",
                                  std::string("DTOPE >= '2024-02-01'"), std::string("DTOPE <= '2024-02-29'")})
    EXPECT_NE(request.find(part), std::string::npos) << request;
}

INSTANTIATE_TEST_SUITE_P(Kinds, BrowserKindTest, ::testing::ValuesIn(kSortes),
                         [](const auto& info) { return "Kind" + std::to_string(info.param.kind); });

// ---------------------------------------------------------------------------- what all kinds share, on kind 1

// A long list is read a page at a time in index order: opening reads the first page
// only; moving down reads on from the last row read, rows refused by the posting
// state included, and a row changed meanwhile by another user is shown as it is now.
TEST_F(BrowserTest, ALongListIsReadAsTheUserMovesDownInIndexOrder) {
  base().exec("DELETE FROM MIRVAE");
  base().exec(
      "WITH RECURSIVE n(i) AS (SELECT 1 UNION ALL SELECT i + 1 FROM n WHERE i < 350) "
      "INSERT INTO MIRVAE (IDENT, TYPE, DTOPE, NUMCP, NPIES) SELECT printf('%08d', i), 'FC', "
      "date('2024-01-01', '+' || (i % 60) || ' days'), '411001', CASE WHEN i % 3 = 0 THEN 'P1' ELSE '' END FROM n");
  base().exec("INSERT OR REPLACE INTO PIECE (NPIES, IMPUT) VALUES ('P1', 'O')");
  const std::string inIndexOrder = "SELECT group_concat(IDENT, ' ') FROM (SELECT IDENT FROM MIRVAE WHERE NPIES = '' "
                                   "ORDER BY DTOPE, IDENT)";
  ouvrirEcran(1);
  mains::saisir(session(), "VMOIAN", "");
  ASSERT_TRUE(mains::saisir(session(), "VIMPUT", "N"));
  auto& list = dynamic_cast<model::Scritere&>(mains::ecranDevant(session()));
  EXPECT_EQ(list.rowCount(), 100u);
  EXPECT_FALSE(list.complete());
  // Another user posts a row of the second page meanwhile: it is no longer shown.
  std::string posted = sql("SELECT IDENT FROM MIRVAE WHERE NPIES = '' ORDER BY DTOPE, IDENT LIMIT 1 OFFSET 150");
  base().exec("UPDATE MIRVAE SET NPIES = 'P1' WHERE IDENT = '" + posted + "'");
  ASSERT_TRUE(mains::choisirLigne(session(), 180));
  EXPECT_EQ(list.rowCount(), 200u);
  EXPECT_EQ(v("MIRVAE.IDENT"), list.row(180).at("IDENT"));
  std::string shown;
  for (const std::string& id : idents()) shown += (shown.empty() ? "" : " ") + id;
  EXPECT_EQ(shown, sql(inIndexOrder));
  EXPECT_TRUE(list.complete());
}

TEST_F(BrowserTest, PeriodComboHasTheMonthsThenNoPeriodAndTheTwoExercises) {
  base().exec("UPDATE PARAM SET PDTCL = '2025-02-28'");
  ouvrirEcran();
  auto& screen = static_cast<browser::MIRVAEAcces&>(mains::ecranDevant(session()));
  std::vector<std::string> rows;
  Table& mem04 = *screen.tableNommee("MEM04");
  Champ anmoi("ANMOI", &mem04), exercice("EXERCICE", &mem04), moian("MOIAN", &mem04);
  for (int rc = mem04.suivant(3); rc == 0; rc = mem04.suivant(1)) {
    screen.executer("VMOIAN_SELECTION", nullptr);
    rows.push_back(anmoi.chaine() + "|" + exercice.chaine() + "|" + moian.chaine() + "|" +
                   screen.variable("MOANO_CHEV")->chaine());
  }
  ASSERT_EQ(rows.size(), 14u + 3u);
  EXPECT_EQ(rows.front(), "202401|N|01/2024|N");
  EXPECT_EQ(rows[11], "202412|N|12/2024|N");
  EXPECT_EQ(rows[13], "202502|N+1|02/2025|O");
  EXPECT_EQ(rows[14], "|||N");
  EXPECT_EQ(rows[15], " Exercice N|N| Exercice N|N");
  EXPECT_EQ(rows[16], " Exercice N+1|N+1| Exercice N+1|N");
}

TEST_F(BrowserTest, PeriodsGiveTheirDateRangesAndHoldTheTypedDates) {
  ouvrirEcran();
  struct Case {
    const char* period;
    const char* from;
    const char* to;
  } cases[] = {
      {"02/2024", "01/02/2024", "29/02/2024"},
      {" Exercice N", "01/01/2024", "31/12/2024"},
      {" Exercice N+1", "01/01/2025", "31/12/2024"},
      {"", "", "31/12/2024"},  // no lower bound, the closing date above
  };
  for (const auto& c : cases) {
    ASSERT_TRUE(mains::saisir(session(), "VMOIAN", c.period)) << c.period;
    EXPECT_EQ(v("VDATE_DEBUT"), c.from) << c.period;
    EXPECT_EQ(v("VDATE_FIN"), c.to) << c.period;
  }
  // Dates typed within a period stay inside it.
  mains::saisir(session(), "VMOIAN", "02/2024");
  EXPECT_FALSE(mains::saisir(session(), "VDATE_DEBUT", "31/01/2024"));
  EXPECT_EQ(dernierMessage(), "La date début doit être comprise entre le 01/02/2024 et le 29/02/2024 !");
  EXPECT_EQ(v("VDATE_DEBUT"), "01/02/2024");
  EXPECT_FALSE(mains::saisir(session(), "VDATE_FIN", "01/03/2024"));
  EXPECT_EQ(dernierMessage(), "La date fin doit être comprise entre le 01/02/2024 et le 29/02/2024 !");
  EXPECT_TRUE(mains::saisir(session(), "VDATE_DEBUT", "10/02/2024"));
  EXPECT_EQ(idents(), rows(1, {2, 6}));
}

// A closed exercise allows consultation; a change only once the user has reopened it,
// and none when the dossier cannot be reopened.
TEST_F(BrowserTest, AClosedYearAllowsAChangeOnlyOnceReopened) {
  struct Case {
    const char* closed;            // PXCLO
    const char* action;
    std::vector<bool> answers;     // to the screen's question, then the reopening's own
    const char* mode;              // handed to the entry screen, "" when it is not opened
    const char* after;             // PXCLO afterwards
  } cases[] = {
      {"C", "MODIFIER", {false}, "", "C"},       {"C", "CREER", {false}, "", "C"},
      {"C", "MODIFIER", {true, false}, "", "C"}, {"C", "CREER", {true, false}, "", "C"},
      {"C", "GERER", {}, "Vv", "C"},             {"O", "CREER", {}, "", "O"},
      {"C", "CREER", {true, true}, "VMCAc", "N"},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(std::string(c.closed) + " " + c.action + " " + std::to_string(c.answers.size()));
    base().exec(std::string("UPDATE PARAM SET PXCLO = '") + c.closed + "'");
    lancements.clear();
    ouvrirEcran();
    mains::saisir(session(), "VMOIAN", "");
    std::size_t questions = session().transcript().textes("question").size();
    for (bool answer : c.answers) user_.ajouterOui(answer);
    mains::appuyer(session(), c.action);
    EXPECT_EQ(session().transcript().textes("question").size() - questions, c.answers.size());
    EXPECT_EQ(sql("SELECT PXCLO FROM PARAM"), c.after);
    if (*c.mode) {
      ASSERT_EQ(lancements.size(), 1u);
      EXPECT_EQ(lancements[0].mode, c.mode);
    } else {
      EXPECT_TRUE(lancements.empty());
    }
    // Without a possible reopening, the dossier's own label says why.
    if (*c.closed == 'O') {
      EXPECT_EQ(dernierMessage(), sql("SELECT TEXTE FROM LIBEL WHERE CODE = '0240'"));
    }
    mains::fermer(session());
  }
}

TEST_F(BrowserTest, PieceViewNeedsAnExistingPostedPiece) {
  ouvrirEcran();
  mains::saisir(session(), "VMOIAN", "");
  struct Case {
    int row;
    const char* message;
  } cases[] = {
      {3, "Opération refusée car la pièce n'a pas été comptabilisée."},
      {1, "Opération impossible car la pièce <P10> est inexistante !"},
  };
  for (const auto& c : cases) {
    mains::choisirLigne(session(), c.row);
    mains::appuyer(session(), "VISU_PIECE");
    EXPECT_EQ(session().transcript().textes("message").back(), c.message);
  }
  EXPECT_TRUE(lancements.empty());
  mains::choisirLigne(session(), 2);
  mains::appuyer(session(), "VISU_PIECE");
  ASSERT_EQ(lancements.size(), 1u);
  EXPECT_EQ(lancements[0].module, "VISUECRI");
  EXPECT_EQ(lancements[0].ident, "P11");
}

// ---------------------------------------------------------------------------- the account part

TEST_F(BrowserTest, ClientAndSupplierListsFollowTheAccountChosenByItsTitle) {
  struct Case {
    int kind;
    const char* account;
    const char* missing;
  } cases[] = {
      {1, "411001", "Le compte Client est inexistant !"},
      {2, "401001", "Le compte Fournisseur est inexistant !"},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.kind);
    ouvrirEcran(c.kind);
    mains::saisir(session(), "VMOIAN", "");
    ASSERT_TRUE(mains::saisir(session(), "VLIBCP1", libelleCompte(c.account)));
    EXPECT_EQ(v("VNUMCP1"), c.account);
    EXPECT_EQ(v("VNUMCP_TOUS"), "");
    EXPECT_EQ(idents(), rows(c.kind, {5, 1, 3}));
    EXPECT_FALSE(mains::saisir(session(), "VLIBCP1", "Personne de ce nom"));
    EXPECT_EQ(dernierMessage(), c.missing);
    EXPECT_EQ(v("VNUMCP1"), c.account);
    ASSERT_TRUE(mains::saisir(session(), "VNUMCP_TOUS", "O"));
    EXPECT_EQ(v("VLIBCP1"), "");
    EXPECT_EQ(idents().size(), 5u);
    mains::fermer(session());
  }
}

TEST_F(BrowserTest, ExpenseNotesAreNeverFilteredOnBothAccounts) {
  ouvrirEcran(3);
  mains::saisir(session(), "VMOIAN", "");
  EXPECT_EQ(v("VNUMCP_TOUS"), "T");
  struct Step {
    const char* object;
    const char* text;
    const char* all;  // VNUMCP_TOUS after it
    const char* staff;
    const char* supplier;
    std::initializer_list<int> shown;
  } steps[] = {
      {"VLIBCP1P", "Bonnefon Lucas", "P", "421001", "", {5, 1, 3}},
      {"VLIBCP1F", "Scierie Maurel Frères", "F", "", "401001", {2}},
      {"VLIBCP1P", "Bonnefon Lucas", "P", "421001", "", {5, 1, 3}},
      {"VNUMCP_TOUS", "T", "T", "", "", {5, 1, 2, 6, 3}},
      {"VLIBCP1F", "Scierie Maurel Frères", "F", "", "401001", {2}},
      {"VLIBCP1F", "", "T", "", "", {5, 1, 2, 6, 3}},
  };
  for (const Step& step : steps) {
    SCOPED_TRACE(std::string(step.object) + " " + step.text);
    ASSERT_TRUE(mains::saisir(session(), step.object, step.text));
    EXPECT_EQ(v("VNUMCP_TOUS"), step.all);
    EXPECT_EQ(v("VNUMCP1P"), step.staff);
    EXPECT_EQ(v("VNUMCP1F"), step.supplier);
    EXPECT_EQ(v("VLIBCP1P"), *step.staff ? libelleCompte(step.staff) : "");
    EXPECT_EQ(v("VLIBCP1F"), *step.supplier ? libelleCompte(step.supplier) : "");
    EXPECT_EQ(idents(), rows(3, step.shown));
  }
  EXPECT_FALSE(mains::saisir(session(), "VLIBCP1P", "Personne de ce nom"));
  EXPECT_EQ(dernierMessage(), "Le compte Personnel est inexistant !");
}

TEST_F(BrowserTest, StaffChoiceOffersOnlyStaffAccounts) {
  ouvrirEcran(3);
  mains::saisir(session(), "VLIBCP1F", "Scierie Maurel Frères");
  user_.ajouterChoix("401002");  // a supplier is not offered
  EXPECT_FALSE(mains::appuyer(session(), "COMPT1P_CHOISIR"));
  EXPECT_EQ(v("VNUMCP1F"), "401001");
  user_.ajouterChoix("421002");
  ASSERT_TRUE(mains::appuyer(session(), "COMPT1P_CHOISIR"));
  EXPECT_EQ(v("VNUMCP1P"), "421002");
  EXPECT_EQ(v("VLIBCP1P"), "Roques Émilie");
  EXPECT_EQ(v("VNUMCP1F"), "");
  EXPECT_EQ(v("VNUMCP_TOUS"), "P");
}

class TreasuryBrowserTest : public BrowserTest {
 protected:
  // A ledger movement on `account`.
  void mouvement(const char* account, const char* date, const char* debit, const char* credit) {
    base().exec(std::string("INSERT INTO MOUVE (UNIQ, NUMCP, DTOPE, MTDEB, MTCRE, INDX2) VALUES (") +
                std::to_string(++uniq_) + ", '" + account + "', '" + date + "', '" + debit + "', '" + credit + "', '" +
                account + "|" + date + "')");
  }
  int uniq_ = 1000;
};

TEST_F(TreasuryBrowserTest, OpensOnTheFirstAccountWithItsBalance) {
  struct Case {
    int kind;
    const char* account;
    std::vector<std::array<const char*, 3>> movements;  // date, debit, credit
    const char* balance;
    const char* side;
  } cases[] = {
      {4, "512100", {}, "0.00", ""},
      {4, "512100", {{"2024-01-10", "1000.00", "0"}, {"2024-03-01", "0", "250.50"}}, "749.50", "D"},
      // Movements outside the exercise up to its closing date do not count.
      {5, "530000", {{"2023-12-31", "900.00", "0"}, {"2024-02-01", "100.00", "300.00"}, {"2025-01-02", "5", "0"}},
       "200.00", "C"},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(std::string(c.account) + " " + c.balance);
    base().exec("DELETE FROM MOUVE");
    for (const auto& m : c.movements) mouvement(c.account, m[0], m[1], m[2]);
    mouvement("512200", "2024-01-10", "77.00", "0");  // the other bank account
    ouvrirEcran(c.kind);
    EXPECT_EQ(v("VNUMCP1"), c.account);
    EXPECT_EQ(v("VLIBCP1"), libelleCompte(c.account));
    EXPECT_EQ(v("V_SOLDE"), c.balance);
    EXPECT_EQ(v("V_TSOLDE"), c.side);
    mains::fermer(session());
  }
}

TEST_F(TreasuryBrowserTest, BalanceFollowsTheAccountChosenAndStaysInTheKeepingCurrency) {
  mouvement("512200", "2024-01-10", "0", "40.00");
  base().exec("UPDATE MIRVAE SET NUMCP = '512200' WHERE IDENT = '" + ident(4, 2) + "'");
  ouvrirEcran(4);
  mains::saisir(session(), "VMOIAN", "");
  ASSERT_TRUE(mains::saisir(session(), "VLIBCP1", libelleCompte("512200")));
  EXPECT_EQ(v("V_SOLDE"), "40.00");
  EXPECT_EQ(v("V_TSOLDE"), "C");
  EXPECT_EQ(idents(), rows(4, {2}));
  // An operation opened in dollars meanwhile leaves the account's balance as it is.
  euro().definirCourante("USD", Jour(testing_support::jourDeTest()));
  mains::ecranDevant(session()).executer("DEBUT_ACTIVATION", nullptr);
  EXPECT_EQ(v("V_SOLDE"), "40.00");
  EXPECT_FALSE(mains::saisir(session(), "VLIBCP1", "Personne de ce nom"));
  EXPECT_EQ(dernierMessage(), "Le compte Banque est inexistant !");
  ASSERT_TRUE(mains::saisir(session(), "VLIBCP1", ""));
  EXPECT_EQ(v("VNUMCP1"), "");
  EXPECT_EQ(v("V_SOLDE"), "0.00");
  EXPECT_EQ(v("V_TSOLDE"), "");
  EXPECT_EQ(idents(), rows(4, {5, 1, 2, 6, 3}));
  mains::ecranDevant(session()).executer("DEBUT_ACTIVATION", nullptr);
  EXPECT_EQ(v("V_SOLDE"), "0.00");
}

TEST_F(TreasuryBrowserTest, WithoutABankAccountTheListIsNotLimited) {
  base().exec("UPDATE COMPT SET CCTRA = 'O' WHERE NATUC = 'B'");
  base().exec("UPDATE MIRVAE SET NUMCP = '512200' WHERE IDENT = '" + ident(4, 2) + "'");
  ouvrirEcran(4);
  mains::saisir(session(), "VMOIAN", "");
  EXPECT_EQ(v("VNUMCP1"), "");
  EXPECT_EQ(v("V_TSOLDE"), "");
  EXPECT_EQ(idents(), rows(4, {5, 1, 2, 6, 3}));
}

TEST_F(TreasuryBrowserTest, PaymentsShowTheirAmountsNegatedAndTheDirectionFilters) {
  ouvrirEcran(4);
  mains::saisir(session(), "VMOIAN", "02/2024");
  struct Step {
    const char* direction;
    std::initializer_list<int> shown;
  } steps[] = {{"", {1, 2, 6}}, {"D", {2, 6}}, {"R", {1}}};
  for (const Step& step : steps) {
    ASSERT_TRUE(mains::saisir(session(), "VTYPE_DR", step.direction));
    EXPECT_EQ(idents(), rows(4, step.shown)) << step.direction;
  }
  mains::saisir(session(), "VTYPE_DR", "");
  auto shown = mains::lignes(session());
  ASSERT_EQ(shown.size(), 3u);
  EXPECT_EQ(shown[0].at("V_TTC"), "120.00");
  EXPECT_EQ(shown[0].at("V_HT"), "120.00");
  EXPECT_EQ(shown[1].at("V_TTC"), "-50.00");
  EXPECT_EQ(shown[1].at("V_HT"), "-50.00");
  EXPECT_EQ(shown[2].at("V_TTC"), "-7.50");
  EXPECT_EQ(sql("SELECT TTC FROM MIRVAE WHERE IDENT = '" + ident(4, 2) + "'"), "50.00");
}

// Without the option, or without parameters at all, the screen leaves at once.
TEST_F(BrowserTest, ScreenLeavesAtOnceWithoutTheOptionOrTheParameters) {
  const std::pair<const char*, const char*> departs[] = {
      {"UPDATE PARAM SET PRE18 = 'N'", "L'option < Gestion simplifiée des opérations > n'est pas active !"},
      {"DELETE FROM PARAM", nullptr}};
  for (const auto& [query, message] : departs) {
    base().exec(query);
    EXPECT_FALSE(mains::ouvrir(session(), "MIRVAE-ACCES1")) << query;
    EXPECT_EQ(session().ecran("MIRVAE-ACCES1"), nullptr);
    if (message) {
      EXPECT_EQ(dernierMessage(), message);
    }
  }
}

}  // namespace
