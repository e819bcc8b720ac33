// Choice windows and readings of the reference tables: accounts, VAT codes,
// currencies, dossier parameters.
#include <gtest/gtest.h>

#include "tests/services/appelant.h"

namespace {

using namespace host;
using testing_support::ServicesTest;

class ChoiceTest : public ServicesTest {
 protected:
  // The rows the last choice window offered, as the user agent saw them.
  struct Fenetre : ReponsesPreparees {
    std::vector<std::string> rows;
    std::optional<std::string> choisir(const std::string& window, const std::vector<std::string>& r) override {
      rows = r;
      return ReponsesPreparees::choisir(window, r);
    }
  };
  void SetUp() override {
    ServicesTest::SetUp();
    session().setAgent(fenetre_);
  }
  Fenetre fenetre_;
};

TEST_F(ChoiceTest, AccountChoiceWritesThePickInTheAskedColumn) {
  Chaine value, shown;
  value = "avant";
  EvtParamRef byLabel(5, &value, &shown, "C", "LIBCP", "N");
  fenetre_.ajouterChoix("Cabinet Vaillergues");
  EXPECT_EQ(appeler("*", "CPCOMPT", "CHOIX_INTITULE_REDUIT", byLabel), 0);
  EXPECT_EQ(value, "Cabinet Vaillergues");
  // Clients in label order; the account left out of the lists (CCTRA "O") is not offered.
  EXPECT_EQ(fenetre_.rows, (std::vector<std::string>{"Brasserie Lissandre", "Cabinet Vaillergues", "Carrère Julien",
                                                     "Gîtes du Moulin Bas", "Hartwell Interiors Inc.",
                                                     "SCI Berthomieu"}));

  EvtParamRef byNumber(5, &value, "421*", "A", "NUMCP", "N");
  fenetre_.ajouterChoix("421002");
  appeler("*", "CPCOMPT", "CHOIX_INTITULE_REDUIT", byNumber);
  EXPECT_EQ(value, "421002");
  EXPECT_EQ(fenetre_.rows, (std::vector<std::string>{"421001", "421002"}));

  // The beginning the user typed narrows the window when the caller gives no pattern.
  value = "7071*";
  EvtParamRef typed(5, &value, &shown, "P", "NUMCP", "N");
  fenetre_.ajouterChoix("707100");
  appeler("*", "CPCOMPT", "CHOIX_INTITULE_REDUIT", typed);
  EXPECT_EQ(fenetre_.rows, (std::vector<std::string>{"707100"}));
  EXPECT_EQ(value, "707100");
}

TEST_F(ChoiceTest, AccountChoiceOffersEveryNatureLetterAndKeepsTheValueOnCancel) {
  Chaine value;
  value = "606100";
  EvtParamRef evt(5, &value, "6*", "HM", "NUMCP", "N");
  fenetre_.ajouterChoix(std::nullopt);
  EXPECT_EQ(appeler("*", "CPCOMPT", "CHOIX_INTITULE_REDUIT", evt), 1);
  EXPECT_EQ(value, "606100");
  EXPECT_EQ(fenetre_.rows.size(), std::stoul(sql("SELECT count(*) FROM COMPT WHERE NUMCP LIKE '6%' AND CCTRA <> 'O' "
                                                  "AND (instr(NATUC, 'H') > 0 OR instr(NATUC, 'M') > 0)")));
  // A value the window did not offer is never written back.
  fenetre_.ajouterChoix("411900");
  echec("*", "CPCOMPT", "INTERFACE", "CHOIX_INTITULE_REDUIT", evt);
  EXPECT_EQ(value, "606100");
}

TEST_F(ChoiceTest, AccountReadingFillsTheInterfaceRecordOrBlanksIt) {
  Chaine number;
  number = "411002";
  EvtParamRef evt(1, &number);
  EXPECT_EQ(appeler("*1", "CPCOMPT", "LECTURE", evt), 0);
  EXPECT_EQ(sql("SELECT LIBCP || '|' || ADRE2 || '|' || VILCP FROM I_CPCOMPT"),
            "SCI Berthomieu|Route de Brantôme|TOCANE-SAINT-APRE");
  number = "999999";
  EXPECT_EQ(appeler("*1", "CPCOMPT", "LECTURE", evt), 1);
  EXPECT_EQ(sql("SELECT count(*) || '|' || LIBCP FROM I_CPCOMPT"), "1|");
}

TEST_F(ChoiceTest, VatCodeChoiceReportsTwoOnCancel) {
  Chaine code, error;
  code = "V10";
  EvtParamRef evt(3, &code, &error, "V");
  fenetre_.ajouterChoix(std::nullopt);
  EXPECT_EQ(appeler("*1", "CPCDTVA", "CHOIX", evt), 2);
  EXPECT_EQ(error, "2");
  EXPECT_EQ(code, "V10");
  EXPECT_EQ(fenetre_.rows, (std::vector<std::string>{"V10", "V20", "V55"}));
  fenetre_.ajouterChoix("V55");
  EXPECT_EQ(appeler("*1", "CPCDTVA", "CHOIX", evt), 0);
  EXPECT_EQ(error, "0");
  EXPECT_EQ(code, "V55");
}

TEST_F(ChoiceTest, CurrencyChoiceAndReadingFillIMonnaie) {
  Chaine code;
  code = "EUR";
  EvtParamRef evt(1, &code);
  fenetre_.ajouterChoix("JPY");
  EXPECT_EQ(appeler("*", "MONNAIE", "CHOIX", evt), 0);
  EXPECT_EQ(code, "JPY");
  EXPECT_EQ(sql("SELECT IDENT || '|' || DECIMALES FROM I_MONNAIE"), "JPY|0");
  fenetre_.ajouterChoix(std::nullopt);
  EXPECT_EQ(appeler("*", "MONNAIE", "CHOIX", evt), 2);
  EXPECT_EQ(code, "JPY");

  code = "USD";
  appeler("*1", "MONNAIE", "LECTURE", evt);
  EXPECT_EQ(sql("SELECT IDENT || '|' || ZONE_EURO FROM I_MONNAIE"), "USD|N");
  code = "XYZ";
  EXPECT_NE(echec("*1", "MONNAIE", "INTERFACE", "LECTURE", evt).find("« XYZ »"), std::string::npos);
}

TEST_F(ChoiceTest, RecordInformationIsShownLineByLine) {
  Chaine info;
  info = "Composant : MIRVAE - N° interne : 00000001\r\n\r\nUtilisateur : testeur\r\n";
  EvtParamRef evt(1, &info);
  appeler("*", "CPPARAM", "INFO_FICHE", evt);
  EXPECT_EQ(vus("message").back(), "Composant : MIRVAE - N° interne : 00000001\n\nUtilisateur : testeur\n");
  EvtParamVal none(new InfoCode(0, 0, 0, 0, 0, 0));
  EXPECT_EQ(appeler("*1", "CPPARAM", "LECTURE", none), 0);
  base().exec("DELETE FROM PARAM");
  EXPECT_EQ(appeler("*1", "CPPARAM", "LECTURE", none), 1);
}

}  // namespace
