// The scripted user: plays the lines of a session script on the screens of a
// session, and answers the session's questions from the answers the script gave.
//
// The script is one cursor over its lines. The top level plays lines in order;
// when a screen runs modally (a module called with appelerModule), the session
// asks the user to work it (piloter) and the player plays the next lines, from the
// same cursor, until that screen has closed. So a script reads as the user acted,
// whatever the depth of the screens.
//
// Answers ("answer ...") are kept in one queue, consumed in order as questions
// come. A question with no answer left, or whose next answer is of another kind,
// fails the script loudly: the screen's action gets a HostError naming the question
// (and is undone), and the script stops at the line that asked it.
//
// Expectations about what the user saw (message, error, question, refused, no
// error) look at the transcript since the last action began; the last action is
// the last acting line that finished (one that opened a modal screen finishes when
// that screen has closed, and its range covers what the screen showed).
#pragma once

#include <deque>
#include <optional>
#include <ostream>
#include <string>
#include <vector>

#include "app/script_format.h"
#include "host/session.h"

namespace app {

class ScriptPlayer : public host::UserAgent {
 public:
  // `out` receives the transcript as it grows, and the lines "say" prints; it must
  // outlive the player.
  ScriptPlayer(std::vector<Instruction> script, std::ostream& out);

  // Plays every line on `session`, whose agent must be this player. Throws
  // ScriptError naming the first line that failed: an expectation that does not
  // hold, a question with no answer given, a mistake of the script (no screen in
  // front, an object the screen does not know), or, at the end, an answer that no
  // question used.
  void play(host::Session& session);

  bool oui(const std::string& question) override;
  std::string dialogue(const std::string& title, const std::string& text,
                       const std::vector<std::string>& choices) override;
  std::optional<std::string> choisir(const std::string& window, const std::vector<std::string>& rows) override;
  // Plays the next lines until `screen` has closed or the script has ended.
  void piloter(host::Session& session, host::Automate& screen) override;

 private:
  struct Answer {
    Op op;
    std::string value;
    const Instruction* given;
  };

  void playNext();
  void execute(const Instruction& line);
  bool act(const Instruction& line);
  void expect(const Instruction& line);
  void expectSql(const Instruction& line);
  // The next answer, which must be one of `ops`; otherwise the script fails.
  Answer take(std::initializer_list<Op> ops, const std::string& asked, const char* wanted);
  [[noreturn]] void failQuestion(const std::string& reason);
  std::vector<host::Entree> shownSinceAction() const;
  void flush();

  std::vector<Instruction> script_;
  std::ostream& out_;
  host::Session* session_ = nullptr;
  std::size_t next_ = 0;
  const Instruction* current_ = nullptr;
  std::deque<Answer> answers_;
  std::optional<ScriptError> failure_;
  std::size_t action_start_ = 0;  // transcript entry numbers (host::Transcript)
  std::optional<bool> last_accepted_;
  std::size_t printed_ = 0;       // entries before this number are printed
};

}  // namespace app
