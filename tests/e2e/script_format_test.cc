// The text of session scripts: every form a line may take, quoting, comments, and
// lines that cannot be understood, named by their number.
#include "app/script_format.h"

#include <gtest/gtest.h>

#include <sstream>

namespace {

using app::Instruction;
using app::Op;

Instruction parse(const std::string& text) {
  Instruction out;
  EXPECT_TRUE(app::parseLine(7, text, out)) << text;
  return out;
}

struct Understood {
  const char* line;
  Op op;
  std::vector<std::string> args;
};

TEST(ScriptFormat, EveryFormReadsItsOperands) {
  const Understood cases[] = {
      {"say \"== Début\"", Op::Say, {"== Début"}},
      {"today 15/03/2024", Op::Today, {"15/03/2024"}},
      {"today 15/03/2024 09:05", Op::TodayAt, {"15/03/2024", "09:05:00"}},
      {"today 2024-03-15 23:59:59", Op::TodayAt, {"2024-03-15", "23:59:59"}},
      {"open MIRVAE-ACCES1", Op::Open, {"MIRVAE-ACCES1"}},
      {"close", Op::Close, {}},
      {"type MIRVAE.DTOPE 15/03/2024", Op::Type, {"MIRVAE.DTOPE", "15/03/2024"}},
      {"type LST_V_HT \"\"", Op::Type, {"LST_V_HT", ""}},
      {"press B_VALID_DOC", Op::Press, {"B_VALID_DOC"}},
      {"choices LST_MIRVAL.NUMCP", Op::Choices, {"LST_MIRVAL.NUMCP"}},
      {"line new", Op::NewLine, {}},
      {"line 3", Op::GoToLine, {"3"}},
      {"line validate", Op::ValidateLine, {}},
      {"line delete", Op::DeleteLine, {}},
      {"line abandon", Op::AbandonLine, {}},
      {"select 02", Op::Select, {"2"}},
      {"answer yes", Op::AnswerYes, {}},
      {"answer no", Op::AnswerNo, {}},
      {"answer dialog 1", Op::AnswerDialog, {"1"}},
      {"answer pick 411001", Op::AnswerPick, {"411001"}},
      {"answer cancel", Op::AnswerCancel, {}},
      {"expect message \"Opération enregistrée\"", Op::ExpectShown, {"message", "Opération enregistrée"}},
      {"expect message containing enregistrée", Op::ExpectShownContaining, {"message", "enregistrée"}},
      {"expect message \"containing\"", Op::ExpectShown, {"message", "containing"}},
      {"expect error \"Compte inexistant\"", Op::ExpectShown, {"erreur", "Compte inexistant"}},
      {"expect error containing inexistant", Op::ExpectShownContaining, {"erreur", "inexistant"}},
      {"expect question \"Supprimer ?\"", Op::ExpectShown, {"question", "Supprimer ?"}},
      {"expect question containing Supprimer", Op::ExpectShownContaining, {"question", "Supprimer"}},
      {"expect no error", Op::ExpectNoError, {}},
      {"expect refused", Op::ExpectRefused, {}},
      {"expect refused LST_V_HT", Op::ExpectRefusedOn, {"LST_V_HT"}},
      {"expect accepted", Op::ExpectAccepted, {}},
      {"expect screen MIRVAE-GESTION1", Op::ExpectScreen, {"MIRVAE-GESTION1"}},
      {"expect value VLIBCP1 \"Brasserie Lissandre\"", Op::ExpectValue, {"VLIBCP1", "Brasserie Lissandre"}},
      {"expect rows 0", Op::ExpectRows, {"0"}},
      {"expect row containing 411001", Op::ExpectRowContaining, {"411001"}},
      {"expect row 2 NUMCP 512200", Op::ExpectRowValue, {"2", "NUMCP", "512200"}},
      {"expect sql \"SELECT count(*) FROM PIECE\" = 1", Op::ExpectSqlEqual, {"SELECT count(*) FROM PIECE", "1"}},
      {"expect sql \"SELECT 1\" != 0", Op::ExpectSqlDifferent, {"SELECT 1", "0"}},
  };
  for (const auto& c : cases) {
    Instruction got = parse(c.line);
    EXPECT_EQ(got.op, c.op) << c.line;
    EXPECT_EQ(got.args, c.args) << c.line;
    EXPECT_EQ(got.line, 7);
  }
}

TEST(ScriptFormat, QuotesKeepBlanksHashesQuotesAndAccentsAndTheLineIsQuotedBack) {
  Instruction got = parse("  type\tVLIB \"Facture client n° \"\"A\"\" # 2\"   # le libellé");
  EXPECT_EQ(got.args, (std::vector<std::string>{"VLIB", "Facture client n° \"A\" # 2"}));
  EXPECT_EQ(got.text, "type VLIB \"Facture client n° \"\"A\"\" # 2\"");
}

TEST(ScriptFormat, CommentsAndBlankLinesAreSkippedAndLinesKeepTheirNumbers) {
  std::istringstream in("# en-tête\n\n   \nopen A # ouvre\r\n\t# rien\nclose\n");
  auto script = app::parseScript(in);
  ASSERT_EQ(script.size(), 2u);
  EXPECT_EQ(script[0].line, 4);
  EXPECT_EQ(script[0].args, std::vector<std::string>{"A"});
  EXPECT_EQ(script[1].line, 6);
  Instruction none;
  EXPECT_FALSE(app::parseLine(1, "   # seulement un commentaire", none));
}

TEST(ScriptFormat, ALineThatCannotBeUnderstoodIsNamedWithWhy) {
  const std::pair<const char*, const char*> cases[] = {
      {"frobnicate X", "instruction inconnue « frobnicate » ; instructions : say, today, open"},
      {"\"open\" X", "instruction inconnue « open »"},
      {"line", "forme inconnue ; s'écrit : line new | line validate | line delete | line abandon | line N"},
      {"line next", "s'écrit : line new"},
      {"line 0", "« 0 » n'est pas un nombre à partir de 1"},
      {"select x", "« x » n'est pas un nombre à partir de 1"},
      {"expect rows -1", "« -1 » n'est pas un nombre entier positif"},
      {"today 31/02/2024", "« 31/02/2024 » n'est pas une date"},
      {"today 15/03/2024 24:00", "« 24:00 » n'est pas une heure"},
      {"today 15/03/2024 9:05", "« 9:05 » n'est pas une heure"},
      {"open \"\"", "nom vide"},
      {"type \"VNOM", "guillemet non refermé"},
      {"type \"VNOM\"x y", "un blanc doit suivre le guillemet fermant"},
      {"expect sql \"SELECT 1\" == 1", "s'écrit : expect message containing TEXT"},
      {"close now", "s'écrit : close"},
  };
  for (const auto& [line, why] : cases) {
    std::istringstream in("open A\n\n" + std::string(line) + "\nclose\n");
    try {
      app::parseScript(in);
      ADD_FAILURE() << "understood: " << line;
    } catch (const app::ScriptError& e) {
      EXPECT_EQ(e.line(), 3) << line;
      EXPECT_NE(std::string(e.what()).find(why), std::string::npos) << line << " -> " << e.what();
      EXPECT_EQ(e.describe("essai.txt").rfind("essai.txt:3: ", 0), 0u) << e.describe("essai.txt");
    }
  }
}

}  // namespace
