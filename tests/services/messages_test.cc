#include "services/messages.h"

#include <gtest/gtest.h>

#include "tests/services/appelant.h"

namespace {

using namespace host;
using testing_support::ServicesTest;

using MessagesTest = ServicesTest;

TEST_F(MessagesTest, MessOkShowsItsTextToTheUser) {
  EvtParamRef evt(1, "Le compte Client est inexistant !");
  EXPECT_EQ(appeler("*", "CPMESSAG", "MESS_OK", evt), 0);
  EXPECT_EQ(vus("message"), std::vector<std::string>{"Le compte Client est inexistant !"});
}

// The answer of a yes/no question comes back as the method result, 1 for yes, from
// the message library and from the accounting library alike; the accounting one also
// writes it into its second parameter.
TEST_F(MessagesTest, MessOnAnswersOneForYes) {
  struct Case {
    const char* library;
    const char* module;
    bool yes;
  };
  for (Case c : {Case{"CPMESSAG", "INTERFACE", true}, Case{"CPMESSAG", "INTERFACE", false},
                 Case{"COMPTA", "MOD_CAL_BIBLIOPROC", true}, Case{"COMPTA", "MOD_CAL_BIBLIOPROC", false}}) {
    SCOPED_TRACE(std::string(c.library) + (c.yes ? " oui" : " non"));
    user_.ajouterOui(c.yes);
    Entier answer(7);
    EvtParamRef evt(2, "Confirmez-vous la saisie du N° pièce ?", &answer);
    EXPECT_EQ(appeler("*", c.library, "MESS_ON", evt, c.module), c.yes ? 1 : 0);
    EXPECT_EQ(vus("question").back(), "Confirmez-vous la saisie du N° pièce ?");
    if (std::string(c.library) == "COMPTA") {
      EXPECT_EQ(answer.entier(), c.yes ? 1 : 0);
    }
  }
}

TEST_F(MessagesTest, MessOk2ReturnsTheButtonAndMessOk3ShowsTheMemo) {
  base().exec("INSERT INTO LIBE1 (CODE, TEXTE) VALUES ('MEMO1.TXT', 'Compte réservé aux écritures de clôture.')");
  user_.ajouterDialogue("2");
  Chaine choice;
  EvtParamRef ok2(2, "Le compte suivant est interdit en saisie : 411900", &choice);
  appeler("*", "CPMESSAG", "MESS_OK2", ok2);
  EXPECT_EQ(choice, "2");
  EvtParamRef ok3(1, "MEMO1.TXT");
  appeler("*", "CPMESSAG", "MESS_OK3", ok3);
  EXPECT_EQ(vus("message").back(), "Compte réservé aux écritures de clôture.");
  EvtParamRef missing(1, "MEMO9.TXT");
  appeler("*", "CPMESSAG", "MESS_OK3", missing);
  EXPECT_EQ(vus("message").back(), "Le mémo « MEMO9.TXT » est introuvable.");
}

TEST_F(MessagesTest, RemplacerReplacesEveryOccurrenceInPlace) {
  struct Case {
    const char* text;
    const char* find;
    const char* replacement;
    const char* expected;
  };
  for (Case c : {Case{"Facture client n° [PIECE]", "[PIECE]", "VT125", "Facture client n° VT125"},
                 Case{"[PIECE] / [PIECE]", "[PIECE]", "7", "7 / 7"},
                 Case{"aaa", "a", "aa", "aaaaaa"},
                 Case{"Opération bancaire", "[PIECE]", "12", "Opération bancaire"},
                 Case{"Facture [PIECE]", "", "12", "Facture [PIECE]"}}) {
    Chaine text;
    text = c.text;
    EvtParamRef evt(3, &text, c.find, c.replacement);
    appeler("*", "SYSASCII", "REMPLACER", evt);
    EXPECT_EQ(text.chaine(), c.expected) << c.text;
  }
}

}  // namespace
