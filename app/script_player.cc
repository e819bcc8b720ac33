#include "app/script_player.h"

#include <sqlite3.h>

#include <algorithm>
#include <cctype>
#include <memory>

#include "host/automate.h"
#include "host/clock.h"
#include "host/decimal.h"
#include "host/error.h"
#include "host/value.h"
#include "model/mains.h"

namespace app {

namespace {

std::string inQuotes(const std::string& s) { return "« " + s + " »"; }

// "« a », « b »", at most `limit` of them.
std::string listed(const std::vector<std::string>& texts, std::size_t limit = 10) {
  std::string out;
  for (std::size_t i = 0; i < texts.size() && i < limit; ++i) out += (i ? ", " : "") + inQuotes(texts[i]);
  if (texts.size() > limit) out += ", … (" + std::to_string(texts.size()) + " en tout)";
  return out;
}

// Whether `name` appears in `text` as a whole name: not inside a longer one
// ("V_HT" is not in "LST_V_HT"); a dot separates ("DTOPE" is in "MIRVAE.DTOPE").
bool namesControl(const std::string& text, const std::string& name) {
  auto inName = [](char c) { return std::isalnum(static_cast<unsigned char>(c)) || c == '_'; };
  for (std::size_t at = text.find(name); at != std::string::npos; at = text.find(name, at + 1)) {
    bool before = at == 0 || !inName(text[at - 1]);
    bool after = at + name.size() == text.size() || !inName(text[at + name.size()]);
    if (before && after) return true;
  }
  return false;
}

// Values read from the dossier compare as numbers when both are numbers (an amount
// stored "119.60" equals 119.6), as text otherwise.
bool sameValue(const std::string& got, const std::string& wanted) {
  auto a = host::Decimal::parse(got), b = host::Decimal::parse(wanted);
  if (a && b) return *a == *b;
  return got == wanted;
}

struct KindWords {
  const char* kind;
  const char* none;       // "aucun message"
  const char* noneShown;  // "aucun message montré"
  const char* plural;     // "messages"
};
const KindWords kKinds[] = {
    {"message", "aucun message", "aucun message montré", "messages"},
    {"erreur", "aucune erreur", "aucune erreur montrée", "erreurs"},
    {"question", "aucune question", "aucune question posée", "questions"},
};

const KindWords& wordsFor(const std::string& kind) {
  for (const auto& k : kKinds)
    if (kind == k.kind) return k;
  throw host::HostError("sorte d'entrée inconnue « " + kind + " »");
}

[[noreturn]] void failLine(const Instruction& line, const std::string& reason) {
  throw ScriptError(line.line, line.text, reason);
}

}  // namespace

ScriptPlayer::ScriptPlayer(std::vector<Instruction> script, std::ostream& out)
    : script_(std::move(script)), out_(out) {}

void ScriptPlayer::play(host::Session& session) {
  if (session_ != &session) printed_ = 0;  // another session numbers its entries from 0
  session_ = &session;
  while (!failure_ && next_ < script_.size()) playNext();
  if (!failure_ && !answers_.empty()) {
    const Instruction& given = *answers_.front().given;
    failure_ = ScriptError(given.line, given.text, "réponse jamais demandée : aucune question ne l'a prise");
  }
  flush();
  if (failure_) throw *failure_;
}

void ScriptPlayer::piloter(host::Session& session, host::Automate& screen) {
  // The screen may be gone (closed and freed) after any line: look for it among
  // the open screens by address before asking it anything.
  auto open = [&] {
    auto screens = session.ecrans();
    return std::find(screens.begin(), screens.end(), &screen) != screens.end() && !screen.estTermine();
  };
  while (!failure_ && next_ < script_.size() && open()) playNext();
}

void ScriptPlayer::playNext() {
  const Instruction& line = script_[next_++];
  const Instruction* outer = current_;
  current_ = &line;
  try {
    execute(line);
  } catch (const ScriptError& e) {
    if (!failure_) failure_ = e;
  } catch (const std::exception& e) {
    if (!failure_) failure_ = ScriptError(line.line, line.text, e.what());
  }
  current_ = outer;
  flush();
}

void ScriptPlayer::execute(const Instruction& line) {
  const auto& a = line.args;
  switch (line.op) {
    case Op::Say:
      flush();
      out_ << a[0] << "\n";
      return;
    case Op::Today:
    case Op::TodayAt:
      host::clock::setToday(**host::lireJour(a[0]));
      if (line.op == Op::TodayAt) host::clock::setTimeOfDay(a[1]);
      return;
    case Op::AnswerYes:
    case Op::AnswerNo:
    case Op::AnswerCancel:
    case Op::AnswerDialog:
    case Op::AnswerPick:
      answers_.push_back({line.op, a.empty() ? std::string() : a[0], &line});
      return;
    case Op::Open:
    case Op::Close:
    case Op::Type:
    case Op::Press:
    case Op::Choices:
    case Op::NewLine:
    case Op::GoToLine:
    case Op::ValidateLine:
    case Op::DeleteLine:
    case Op::AbandonLine:
    case Op::Select: {
      const host::Transcript& transcript = session_->transcript();
      std::size_t start = transcript.oubliees() + transcript.entrees().size();
      action_start_ = start;
      bool accepted = act(line);
      // Lines played inside a modal screen moved the mark; this action, which
      // finishes last, covers them.
      action_start_ = start;
      last_accepted_ = accepted;
      return;
    }
    default:
      expect(line);
  }
}

bool ScriptPlayer::act(const Instruction& line) {
  host::Session& s = *session_;
  const auto& a = line.args;
  switch (line.op) {
    case Op::Open: return model::ouvrir(s, a[0]);
    case Op::Close: model::fermer(s); return true;
    case Op::Type: return model::saisir(s, a[0], a[1]);
    case Op::Press: return model::appuyer(s, a[0]);
    case Op::Choices: return model::ouvrirChoix(s, a[0]);
    case Op::NewLine: return model::nouvelleLigne(s);
    case Op::GoToLine: return model::allerLigne(s, std::stoi(a[0]));
    case Op::ValidateLine: return model::validerLigne(s);
    case Op::DeleteLine: return model::supprimerLigne(s);
    case Op::AbandonLine: return model::abandonnerLigne(s);
    case Op::Select: return model::choisirLigne(s, std::stoi(a[0]));
    default: throw host::HostError("instruction sans action");
  }
}

std::vector<host::Entree> ScriptPlayer::shownSinceAction() const {
  const host::Transcript& transcript = session_->transcript();
  const auto& entries = transcript.entrees();
  std::size_t from = std::min(std::max(action_start_, transcript.oubliees()) - transcript.oubliees(), entries.size());
  return {entries.begin() + static_cast<std::ptrdiff_t>(from), entries.end()};
}

void ScriptPlayer::expect(const Instruction& line) {
  const auto& a = line.args;
  auto textsOf = [&](const std::string& kind) {
    std::vector<std::string> out;
    for (const auto& e : shownSinceAction())
      if (e.sorte == kind) out.push_back(e.texte);
    return out;
  };
  auto lastAction = [&] {
    if (!last_accepted_) failLine(line, "aucune action n'a encore été jouée");
    return *last_accepted_;
  };

  switch (line.op) {
    case Op::ExpectShown:
    case Op::ExpectShownContaining: {
      bool containing = line.op == Op::ExpectShownContaining;
      auto texts = textsOf(a[0]);
      bool found = std::any_of(texts.begin(), texts.end(), [&](const std::string& t) {
        return containing ? t.find(a[1]) != std::string::npos : t == a[1];
      });
      if (found) return;
      const KindWords& words = wordsFor(a[0]);
      failLine(line, std::string(words.none) + (containing ? " contenant " : " ") + inQuotes(a[1]) +
           " depuis la dernière action ; " +
           (texts.empty() ? std::string(words.noneShown) : std::string(words.plural) + " : " + listed(texts)));
    }
    case Op::ExpectNoError: {
      auto errors = textsOf("erreur");
      if (!errors.empty()) failLine(line, "erreurs depuis la dernière action : " + listed(errors));
      return;
    }
    case Op::ExpectAccepted: {
      if (lastAction()) return;
      auto why = textsOf("refus"), errors = textsOf("erreur");
      why.insert(why.end(), errors.begin(), errors.end());
      failLine(line, "la dernière action a été refusée" + (why.empty() ? std::string() : " : " + listed(why)));
    }
    case Op::ExpectRefused:
    case Op::ExpectRefusedOn: {
      if (lastAction()) failLine(line, "la dernière action a été acceptée");
      auto refusals = textsOf("refus");
      if (refusals.empty()) {
        auto errors = textsOf("erreur");
        failLine(line, "la dernière action a échoué sans refus" + (errors.empty() ? std::string() : " : " + listed(errors)));
      }
      if (line.op == Op::ExpectRefused) return;
      if (std::any_of(refusals.begin(), refusals.end(), [&](const std::string& r) { return namesControl(r, a[0]); }))
        return;
      failLine(line, "aucun refus sur " + a[0] + " ; refus : " + listed(refusals));
    }
    case Op::ExpectScreen: {
      host::Automate* front = session_->ecranCourant();
      if (!front) failLine(line, "aucun écran n'est ouvert");
      if (front->code() != a[0]) failLine(line, "l'écran devant est " + inQuotes(front->code()));
      return;
    }
    case Op::ExpectValue: {
      std::string shown = model::valeur(*session_, a[0]);
      if (shown != a[1]) failLine(line, a[0] + " vaut " + inQuotes(shown) + ", attendu " + inQuotes(a[1]));
      return;
    }
    case Op::ExpectRows: {
      std::size_t n = model::nombreLignes(*session_);
      if (n != std::stoul(a[0])) failLine(line, std::to_string(n) + " lignes dans la liste, attendu " + a[0]);
      return;
    }
    case Op::ExpectRowContaining: {
      auto rows = model::lignes(*session_);
      for (const auto& row : rows)
        for (const auto& [column, value] : row)
          if (value.find(a[0]) != std::string::npos) return;
      failLine(line, "aucune des " + std::to_string(rows.size()) + " lignes de la liste ne contient " + inQuotes(a[0]));
    }
    case Op::ExpectRowValue: {
      auto rows = model::lignes(*session_);
      std::size_t n = std::stoul(a[0]);
      if (n > rows.size()) failLine(line, "la liste n'a que " + std::to_string(rows.size()) + " lignes");
      const auto& row = rows[n - 1];
      auto it = row.find(a[1]);
      if (it == row.end()) {
        std::vector<std::string> columns;
        for (const auto& [column, value] : row) columns.push_back(column);
        failLine(line, "pas de colonne " + a[1] + " ; colonnes : " + listed(columns, 40));
      }
      if (it->second != a[2]) failLine(line, a[1] + " vaut " + inQuotes(it->second) + ", attendu " + inQuotes(a[2]));
      return;
    }
    case Op::ExpectSqlEqual:
    case Op::ExpectSqlDifferent:
      expectSql(line);
      return;
    default:
      failLine(line, "instruction inconnue du joueur");
  }
}

namespace {

// Lets a statement read tables and call functions, nothing else: no write, no
// transaction or savepoint, no ATTACH, no pragma. `denied` is set when it refused.
int onlyReads(void* denied, int action, const char*, const char*, const char*, const char*) {
  switch (action) {
    case SQLITE_SELECT:
    case SQLITE_READ:
    case SQLITE_FUNCTION:
    case SQLITE_RECURSIVE:
      return SQLITE_OK;
    default:
      *static_cast<bool*>(denied) = true;
      return SQLITE_DENY;
  }
}

}  // namespace

// A query of the script reads the dossier as another process would see it, on a
// connection of its own, opened read-only for this query and closed after it: no
// statement can change the dossier, nor leave the session's connection in a state
// (a transaction, a lock, an attached file, a pragma) that its next action would
// meet. It sees what the actions played so far committed, not the session's work
// tables. Only one statement, and only one that reads.
void ScriptPlayer::expectSql(const Instruction& line) {
  const std::string& query = line.args[0];
  const char* readOnly = "une requête de script ne fait que lire le dossier";
  sqlite3* connection = nullptr;
  int opened = sqlite3_open_v2(session_->dossier().c_str(), &connection, SQLITE_OPEN_READONLY, nullptr);
  std::unique_ptr<sqlite3, int (*)(sqlite3*)> db(connection, sqlite3_close);
  if (opened != SQLITE_OK)
    failLine(line, std::string("lecture du dossier impossible : ") + (db ? sqlite3_errmsg(db.get()) : "mémoire"));
  sqlite3_busy_timeout(db.get(), 10000);
  sqlite3_exec(db.get(), "PRAGMA query_only = ON", nullptr, nullptr, nullptr);
  bool denied = false;
  sqlite3_set_authorizer(db.get(), onlyReads, &denied);

  sqlite3_stmt* raw = nullptr;
  const char* tail = nullptr;
  int prepared = sqlite3_prepare_v2(db.get(), query.c_str(), static_cast<int>(query.size()), &raw, &tail);
  std::unique_ptr<sqlite3_stmt, int (*)(sqlite3_stmt*)> statement(raw, sqlite3_finalize);
  if (denied) failLine(line, readOnly);
  if (prepared != SQLITE_OK)
    failLine(line, std::string("requête refusée par la base : ") + sqlite3_errmsg(db.get()));
  if (!statement) failLine(line, "requête vide");
  for (; tail && *tail; ++tail)
    if (!std::isspace(static_cast<unsigned char>(*tail)) && *tail != ';') failLine(line, "une seule requête par ligne");
  if (!sqlite3_stmt_readonly(statement.get())) failLine(line, readOnly);
  int rc = sqlite3_step(statement.get());
  if (rc != SQLITE_ROW && rc != SQLITE_DONE)
    failLine(line, std::string("requête en échec : ") + sqlite3_errmsg(db.get()));
  // No row, or a null, reads as the empty text.
  std::string got;
  if (rc == SQLITE_ROW && sqlite3_column_type(statement.get(), 0) != SQLITE_NULL)
    got = reinterpret_cast<const char*>(sqlite3_column_text(statement.get(), 0));
  bool same = sameValue(got, line.args[1]);
  if (line.op == Op::ExpectSqlEqual && !same) failLine(line, "la requête donne " + inQuotes(got) + ", attendu " + inQuotes(line.args[1]));
  if (line.op == Op::ExpectSqlDifferent && same) failLine(line, "la requête donne " + inQuotes(got));
}

// ---------------------------------------------------------------------------- questions

ScriptPlayer::Answer ScriptPlayer::take(std::initializer_list<Op> ops, const std::string& asked, const char* wanted) {
  if (answers_.empty()) failQuestion("aucune réponse donnée à " + asked);
  Answer answer = answers_.front();
  if (std::find(ops.begin(), ops.end(), answer.op) == ops.end())
    failQuestion(asked + " attend " + wanted + ", la réponse suivante est " + inQuotes(answer.given->text) +
                 " (ligne " + std::to_string(answer.given->line) + ")");
  answers_.pop_front();
  return answer;
}

void ScriptPlayer::failQuestion(const std::string& reason) {
  const Instruction* line = current_;
  if (!failure_) failure_ = ScriptError(line ? line->line : 0, line ? line->text : std::string(), reason);
  // The screen that asked gets an error: its action is undone, as when a person
  // walks away from a question.
  throw host::HostError(reason);
}

bool ScriptPlayer::oui(const std::string& question) {
  return take({Op::AnswerYes, Op::AnswerNo}, "la question " + inQuotes(question), "oui ou non").op == Op::AnswerYes;
}

std::string ScriptPlayer::dialogue(const std::string& title, const std::string& text,
                                   const std::vector<std::string>& choices) {
  std::string asked = "le dialogue " + inQuotes(title.empty() ? text : title + " : " + text);
  std::string code = take({Op::AnswerDialog}, asked, "un code de choix").value;
  bool offered = std::any_of(choices.begin(), choices.end(), [&](const std::string& c) {
    return !code.empty() && c.rfind(code, 0) == 0;
  });
  if (!offered) failQuestion(asked + " n'offre pas la réponse " + inQuotes(code) + " ; choix : " + listed(choices));
  return code;
}

std::optional<std::string> ScriptPlayer::choisir(const std::string& window, const std::vector<std::string>& rows) {
  std::string asked = "la fenêtre de choix " + inQuotes(window);
  Answer answer = take({Op::AnswerPick, Op::AnswerCancel}, asked, "un choix ou un abandon");
  if (answer.op == Op::AnswerCancel) return std::nullopt;
  if (std::find(rows.begin(), rows.end(), answer.value) == rows.end())
    failQuestion(inQuotes(answer.value) + " ne figure pas dans " + asked + " : " + listed(rows));
  return answer.value;
}

// ---------------------------------------------------------------------------- transcript

void ScriptPlayer::flush() {
  if (!session_) return;
  const host::Transcript& transcript = session_->transcript();
  const auto& entries = transcript.entrees();
  host::Transcript fresh;
  for (std::size_t i = std::max(printed_, transcript.oubliees()) - transcript.oubliees(); i < entries.size(); ++i)
    fresh.ajouter(entries[i].sorte, entries[i].texte);
  out_ << fresh.rendu();
  out_.flush();
  printed_ = transcript.oubliees() + entries.size();
}

}  // namespace app
