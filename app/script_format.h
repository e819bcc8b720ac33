// The text of a session script: a scripted user, one action or expectation a line.
//
// A line is words separated by blanks. A word with blanks, a "#", or no text at all
// is written between double quotes, a quote inside doubled: "Facture n° ""A""".
// A "#" where a word would start begins a comment; blank lines are ignored. The
// forms a line may take are listed by forms() and explained in the README
// ("Session scripts"); a line that matches none of them is refused with the forms
// of its first word.
#pragma once

#include <istream>
#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

namespace app {

enum class Op {
  Say,
  Today,
  TodayAt,
  Open,
  Close,
  Type,
  Press,
  Choices,
  NewLine,
  GoToLine,
  ValidateLine,
  DeleteLine,
  AbandonLine,
  Select,
  AnswerYes,
  AnswerNo,
  AnswerDialog,
  AnswerPick,
  AnswerCancel,
  ExpectShown,            // kind, text
  ExpectShownContaining,  // kind, text
  ExpectNoError,
  ExpectRefused,
  ExpectRefusedOn,  // control
  ExpectAccepted,
  ExpectScreen,  // module
  ExpectValue,   // object, text
  ExpectRows,    // n
  ExpectRowContaining,  // text
  ExpectRowValue,       // n, column, text
  ExpectSqlEqual,       // query, value
  ExpectSqlDifferent,   // query, value
};

// One understood line.
struct Instruction {
  int line = 0;      // from 1
  std::string text;  // as written, without its comment and outer blanks
  Op op = Op::Say;
  // The operands in the order of the form; for the shown-entry expectations the
  // transcript kind comes first ("message", "erreur", "question").
  std::vector<std::string> args;
};

// A line that cannot be understood, or a line that failed when played.
class ScriptError : public std::runtime_error {
 public:
  ScriptError(int line, std::string text, const std::string& reason)
      : std::runtime_error(reason), line_(line), text_(std::move(text)) {}
  int line() const { return line_; }
  const std::string& text() const { return text_; }
  // "script.txt:12: expect rows 2 : 3 lignes affichées, 2 attendues"
  std::string describe(const std::string& scriptName) const;

 private:
  int line_;
  std::string text_;
};

struct Word {
  std::string text;
  bool quoted = false;
};

// The words of a line, up to its comment. Throws ScriptError for a quote left open
// or a closing quote glued to the next word.
std::vector<Word> splitWords(int line, std::string_view text);

// The instruction a line holds; false for a blank or comment-only line. Throws
// ScriptError naming the line when it matches no form.
bool parseLine(int line, std::string_view text, Instruction& out);

// Every instruction of a script, in order. Throws ScriptError naming the first line
// that cannot be understood, before anything is played.
std::vector<Instruction> parseScript(std::istream& in);

// The forms a line may take, one a string ("type OBJECT VALUE"), in the order tried.
std::vector<std::string> forms();

}  // namespace app
