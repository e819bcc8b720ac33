#include "services/compta.h"

#include <gtest/gtest.h>

#include "host/database.h"
#include "tests/services/appelant.h"

namespace {

using namespace host;
using testing_support::ServicesTest;

class ComptaTest : public ServicesTest {
 protected:
  // Draws a piece number as the entry screen does; returns {number, error}.
  std::pair<long long, long long> tirer(const char* journal, const char* key) {
    Chaine numjl, cle;
    numjl = journal;
    cle = key;
    Double number(-1);
    Entier error(-1);
    EvtParamRef evt(4, &numjl, &cle, &number, &error);
    compta("INCREMENTE_NUMERO_PIECE", evt);
    return {number.entier(), error.entier()};
  }
  std::string compteur(const char* journal, const char* key) {
    return sql(std::string("SELECT NUMERO FROM NUMPI WHERE NUMJL = '") + journal + "' AND CLE = '" + key + "'");
  }
  // Two ledger movements of the bank account and one of another account.
  void mouvements() {
    base().exec(
        "INSERT INTO PIECE (NPIES, NPIEC, NUMJL, DTOPE, LIBPI) VALUES ('00000000001', 'BQ1-7', 'BQ1', '2024-02-10', "
        "'Virement Brasserie Lissandre');"
        "INSERT INTO MOUVE (UNIQ, NPIES, NLIGS, NUMCP, DTOPE, LIBEC, MTDEB, MTCRE) VALUES"
        " (1, '00000000001', '00000000001001', '512100', '2024-02-10', 'Virement reçu', '1200.10', '0'),"
        " (2, '00000000001', '00000000001002', '411001', '2024-02-10', 'Virement reçu', '0', '1200.10'),"
        " (3, '00000000002', '00000000002001', '512100', '2024-03-20', 'Frais', '0', '0.20'),"
        " (4, '00000000003', '00000000003001', '512100', '2023-12-31', 'Report', '0.10', '0');"
        "UPDATE MOUVE SET INDX2 = NUMCP || '|' || DTOPE;");
  }
};

TEST_F(ComptaTest, VerifDossierAcceptsTheDemoAndRefusesIncoherentDates) {
  Entier flag;
  EvtParamRef evt(1, &flag);
  compta("VERIF_DOSSIER", evt);
  EXPECT_EQ(flag.entier(), 1);
  EXPECT_TRUE(vus("message").empty());

  base().exec("UPDATE PARAM SET PDFEX = '2023-12-31'");
  compta("VERIF_DOSSIER", evt);
  EXPECT_EQ(flag.entier(), 0);
  EXPECT_NE(vus("message").back().find("incohérentes"), std::string::npos);

  base().exec("DELETE FROM PARAM");
  flag = 1;
  compta("VERIF_DOSSIER", evt);
  EXPECT_EQ(flag.entier(), 0);
  EXPECT_EQ(vus("message").back(), sql("SELECT TEXTE FROM LIBEL WHERE CODE = '0028'"));
}

TEST_F(ComptaTest, NewExerciseStartsTheDayAfterTheEnd) {
  Date end, start;
  end = "31/12/2024";
  EvtParamRef evt(2, &end, &start);
  compta("CALCUL_DATE_NOUVEL_EX", evt);
  EXPECT_EQ(start.chaine(), "01/01/2025");
}

TEST_F(ComptaTest, TableAnneeMoisListsEveryMonthInOrderAfterEmptyingMem02) {
  base().exec("INSERT INTO MEM02 (ANMOI) VALUES ('199901')");
  Date start, next, closing;
  start = "15/10/2024";
  next = "01/01/2025";
  closing = "28/02/2025";
  EvtParamRef evt(3, &start, &next, &closing);
  compta("TABLE_ANNEE_MOIS", evt);
  EXPECT_EQ(sql("SELECT group_concat(ANMOI, ',') FROM (SELECT ANMOI FROM MEM02 ORDER BY rowid)"),
            "202410,202411,202412,202501,202502");
}

TEST_F(ComptaTest, OptionsComeInTheirFixedOrder) {
  const char* columns[] = {"OPT_TVA",    "OPT_TVA1", "OPT_QTE",    "OPT_QTE1", "OPT_QTE2",
                           "OPT_ANA",    "OPT_ANA1", "OPT_ANA2",   "OPT_ECHCLI", "OPT_ECHFOU",
                           "OPT_ECHAUT", "OPT_ECH",  "OPT_DEVISE", "OPT_REGT"};
  // Each flag on alone must land in its own place, and only there.
  for (int on = 0; on < 14; ++on) {
    std::string reset = "UPDATE PARAM SET ";
    for (int i = 0; i < 14; ++i) reset += std::string(i ? ", " : "") + columns[i] + " = " + (i == on ? "1" : "0");
    base().exec(reset);
    std::vector<std::unique_ptr<Entier>> flags;
    for (int i = 0; i < 14; ++i) flags.push_back(std::make_unique<Entier>(9));
    EvtParamRef evt(14, flags[0].get(), flags[1].get(), flags[2].get(), flags[3].get(), flags[4].get(),
                    flags[5].get(), flags[6].get(), flags[7].get(), flags[8].get(), flags[9].get(),
                    flags[10].get(), flags[11].get(), flags[12].get(), flags[13].get());
    compta("OPTIONS_DOSSIER", evt);
    for (int i = 0; i < 14; ++i) EXPECT_EQ(flags[i]->entier(), i == on ? 1 : 0) << columns[on] << " -> " << i;
  }
}

TEST_F(ComptaTest, VatRateIsTheOneInForceAtTheDate) {
  struct Case {
    const char* code;
    const char* day;
    const char* rate;
    int result;
  };
  for (Case c : {Case{"V20", "31/12/2013", "19.6", 0}, Case{"V20", "01/01/2014", "20", 0},
                 Case{"A20", "15/03/2024", "20", 0}, Case{"V55", "01/06/2010", "5.5", 0},
                 Case{"V10", "31/12/2013", "0", 1}, Case{"X99", "15/03/2024", "0", 1}}) {
    Chaine code;
    code = c.code;
    Date day;
    day = c.day;
    Simple rate(99);
    EvtParamRef evt(3, &code, &day, &rate);
    EXPECT_EQ(compta("LECTURE_HISTO_TXTVA", evt), c.result) << c.code << " " << c.day;
    EXPECT_EQ(rate.chaine(), c.rate) << c.code << " " << c.day;
  }
}

// Each period key has its own counter; numbering restarts from 1 for a new key.
TEST_F(ComptaTest, PieceCountersAreKeptPerJournalAndKey) {
  EXPECT_EQ(tirer("VT", "202403"), std::make_pair(1LL, 0LL));
  EXPECT_EQ(tirer("VT", "202403"), std::make_pair(2LL, 0LL));
  EXPECT_EQ(tirer("VT", "202404"), std::make_pair(1LL, 0LL));
  EXPECT_EQ(tirer("VT", "N"), std::make_pair(1LL, 0LL));
  EXPECT_EQ(tirer("VT", "N+1"), std::make_pair(1LL, 0LL));
  EXPECT_EQ(tirer("AC", "N"), std::make_pair(1LL, 0LL));
  EXPECT_EQ(tirer("VT", "N"), std::make_pair(2LL, 0LL));
  EXPECT_EQ(compteur("VT", "202403"), "2");
  EXPECT_EQ(compteur("VT", "N"), "2");
  EXPECT_EQ(compteur("VT", "N+1"), "1");
}

TEST_F(ComptaTest, PieceCounterRefusesUnknownJournalsAndKeys) {
  for (auto [journal, key] : {std::pair{"VT", "2024"}, std::pair{"VT", "202413"}, std::pair{"ZZ", "N"}}) {
    Chaine numjl, cle;
    numjl = journal;
    cle = key;
    Double number;
    Entier error;
    EvtParamRef evt(4, &numjl, &cle, &number, &error);
    std::string message = echec("COMPTA", "COMPTA", "MOD_CAL_BIBLIOPROC", "INCREMENTE_NUMERO_PIECE", evt);
    EXPECT_NE(message.find(std::string(journal == std::string("ZZ") ? journal : key)), std::string::npos) << message;
  }
  EXPECT_EQ(sql("SELECT count(*) FROM NUMPI"), "0");
}

TEST_F(ComptaTest, PrefixIsBuiltFromThePatternAndTheYearMonth) {
  struct Case {
    const char* pattern;
    const char* expected;
  };
  for (Case c : {Case{"VT", "VT"}, Case{"VT[AA][MM]-", "VT2403-"}, Case{"[AAAA]/[MM]/", "2024/03/"},
                 Case{"", ""}}) {
    Chaine pattern, moano, prefix;
    pattern = c.pattern;
    moano = "202403";
    EvtParamRef evt(3, &pattern, &moano, &prefix);
    compta("PREFIXE_NUMERO_PIECE", evt);
    EXPECT_EQ(prefix.chaine(), c.expected) << c.pattern;
  }
}

TEST_F(ComptaTest, NatureLabelsComeFromTheLabelTables) {
  struct Case {
    const char* letters;
    const char* label;
  };
  for (Case c : {Case{"C", "Client"}, Case{"HM", "Charge / Immobilisation"}, Case{"", ""}}) {
    Chaine letters, label;
    letters = c.letters;
    EvtParamRef evt(2, &letters, &label);
    compta("LIBELLE_NATURE_COMPTE", evt);
    EXPECT_EQ(label.chaine(), c.label);
  }
  Chaine letters, label;
  letters = "Z";
  EvtParamRef evt(2, &letters, &label);
  EXPECT_NE(echec("COMPTA", "COMPTA", "MOD_CAL_BIBLIOPROC", "LIBELLE_NATURE_COMPTE", evt).find("« Z »"),
            std::string::npos);
}

TEST_F(ComptaTest, AccountTotalsAreExactOverTheDateRange) {
  mouvements();
  Chaine account;
  account = "512100";
  Date from, to;
  from = "01/01/2024";
  to = "31/12/2024";
  Monnaie debit, credit;
  Chaine currency;
  currency = "EUR";
  EvtParamRef evt(7, &account, "C", &from, &to, &debit, &credit, &currency);
  compta("CALCUL_CUMULS_COMPTE", evt);
  EXPECT_EQ(debit.decimal(), *Decimal::parse("1200.10"));
  EXPECT_EQ(credit.decimal(), *Decimal::parse("0.20"));
  from = "";  // no lower bound: the movement of 2023 counts too
  compta("CALCUL_CUMULS_COMPTE", evt);
  EXPECT_EQ(debit.decimal(), *Decimal::parse("1200.20"));
}

TEST_F(ComptaTest, VisuecriShowsThePieceOrSaysItIsMissing) {
  mouvements();
  Chaine piece;
  piece = "00000000001";
  EvtParamRef evt(1, &piece);
  ASSERT_TRUE(lancer("", "COMPTA", "VISUECRI", evt));
  EXPECT_EQ(vus("message").back(),
            "Pièce <00000000001> - journal BQ1 - n° BQ1-7 du 10/02/2024@Virement Brasserie Lissandre"
            "@512100 Virement reçu : débit 1200.10, crédit 0.00"
            "@411001 Virement reçu : débit 0.00, crédit 1200.10"
            "@Total : débit 1200.10, crédit 1200.10");
  piece = "00000000099";
  ASSERT_TRUE(lancer("", "COMPTA", "VISUECRI", evt));
  EXPECT_EQ(vus("message").back(), "La pièce <00000000099> est inexistante !");
}

TEST_F(ComptaTest, ReopeningAClosedExerciseNeedsTheUsersYes) {
  base().exec("UPDATE PARAM SET PXCLO = 'C'");
  Chaine caller;
  caller = "MIRVAE-ACCES1";
  EvtParamRef evt(1, &caller);
  user_.ajouterOui(false);
  ASSERT_TRUE(lancer("", "COMPTA", "LANCE_REOUVERTURE_ANNU", evt));
  EXPECT_EQ(sql("SELECT PXCLO FROM PARAM"), "C");
  user_.ajouterOui(true);
  ASSERT_TRUE(lancer("", "COMPTA", "LANCE_REOUVERTURE_ANNU", evt));
  EXPECT_EQ(sql("SELECT PXCLO FROM PARAM"), "N");
  EXPECT_EQ(vus("question").size(), 2u);

  base().exec("UPDATE PARAM SET PXCLO = 'O'");
  ASSERT_TRUE(lancer("", "COMPTA", "LANCE_REOUVERTURE_ANNU", evt));
  EXPECT_EQ(sql("SELECT PXCLO FROM PARAM"), "O");
  EXPECT_EQ(vus("question").size(), 2u);
}

TEST_F(ComptaTest, ModelChoiceOffersTheJournalsModelsAndKeepsTheCodeOnCancel) {
  Entier chosen(-1);
  Chaine code, dossier, journal;
  code = "VTPOSE";
  journal = "AC";
  EvtParamRef evt(4, &chosen, &code, &dossier, &journal);
  user_.ajouterChoix(std::nullopt);
  ASSERT_TRUE(lancer("", "COMPTA", "CHOIX_MODELE_ECRITURES", evt));
  EXPECT_EQ(chosen.entier(), 0);
  EXPECT_EQ(code, "VTPOSE");
  user_.ajouterChoix("ACBOIS");
  ASSERT_TRUE(lancer("", "COMPTA", "CHOIX_MODELE_ECRITURES", evt));
  EXPECT_EQ(chosen.entier(), 1);
  EXPECT_EQ(code, "ACBOIS");
  // A model of another journal is not on offer.
  user_.ajouterChoix("VTPOSE");
  EXPECT_FALSE(lancer("", "COMPTA", "CHOIX_MODELE_ECRITURES", evt));
  EXPECT_EQ(code, "ACBOIS");
}

}  // namespace
