#include "app/script_format.h"

#include <algorithm>
#include <cctype>
#include <optional>

#include "host/text.h"
#include "host/value.h"

namespace app {

namespace {

// A form: literal words in lower case (and "=", "!="), operands in capitals. The
// first form that fits a line wins, so a literal form comes before an operand one
// of the same length ("line new" before "line N").
struct Form {
  const char* pattern;
  Op op;
  const char* kind = nullptr;  // the transcript kind an expectation looks at
};

const Form kForms[] = {
    {"say TEXT", Op::Say},
    {"today DATE", Op::Today},
    {"today DATE TIME", Op::TodayAt},
    {"open MODULE", Op::Open},
    {"close", Op::Close},
    {"type OBJECT VALUE", Op::Type},
    {"press ACTION", Op::Press},
    {"choices OBJECT", Op::Choices},
    {"line new", Op::NewLine},
    {"line validate", Op::ValidateLine},
    {"line delete", Op::DeleteLine},
    {"line abandon", Op::AbandonLine},
    {"line N", Op::GoToLine},
    {"select N", Op::Select},
    {"answer yes", Op::AnswerYes},
    {"answer no", Op::AnswerNo},
    {"answer dialog CODE", Op::AnswerDialog},
    {"answer pick VALUE", Op::AnswerPick},
    {"answer cancel", Op::AnswerCancel},
    {"expect message containing TEXT", Op::ExpectShownContaining, "message"},
    {"expect message TEXT", Op::ExpectShown, "message"},
    {"expect error containing TEXT", Op::ExpectShownContaining, "erreur"},
    {"expect error TEXT", Op::ExpectShown, "erreur"},
    {"expect question containing TEXT", Op::ExpectShownContaining, "question"},
    {"expect question TEXT", Op::ExpectShown, "question"},
    {"expect no error", Op::ExpectNoError},
    {"expect refused", Op::ExpectRefused},
    {"expect refused CONTROL", Op::ExpectRefusedOn},
    {"expect accepted", Op::ExpectAccepted},
    {"expect screen MODULE", Op::ExpectScreen},
    {"expect value OBJECT TEXT", Op::ExpectValue},
    {"expect rows COUNT", Op::ExpectRows},
    {"expect row containing TEXT", Op::ExpectRowContaining},
    {"expect row N COLUMN TEXT", Op::ExpectRowValue},
    {"expect sql QUERY = VALUE", Op::ExpectSqlEqual},
    {"expect sql QUERY != VALUE", Op::ExpectSqlDifferent},
};

std::vector<std::string> patternWords(const char* pattern) {
  std::vector<std::string> out;
  std::string word;
  for (const char* p = pattern;; ++p) {
    if (*p == ' ' || *p == '\0') {
      out.push_back(word);
      word.clear();
      if (*p == '\0') break;
    } else {
      word += *p;
    }
  }
  return out;
}

bool isOperand(const std::string& word) {
  return std::isupper(static_cast<unsigned char>(word[0])) != 0;
}

bool allDigits(const std::string& s) {
  if (s.empty() || s.size() > 9) return false;
  for (char c : s)
    if (!std::isdigit(static_cast<unsigned char>(c))) return false;
  return true;
}

// "HH:MM" or "HH:MM:SS" as "HH:MM:SS"; nothing for any other text.
std::optional<std::string> readTime(const std::string& s) {
  if (s.size() != 5 && s.size() != 8) return std::nullopt;
  for (std::size_t i = 0; i < s.size(); ++i) {
    bool colon = i == 2 || i == 5;
    if (colon ? s[i] != ':' : !std::isdigit(static_cast<unsigned char>(s[i]))) return std::nullopt;
  }
  auto part = [&](std::size_t at) { return (s[at] - '0') * 10 + (s[at + 1] - '0'); };
  if (part(0) > 23 || part(3) > 59 || (s.size() == 8 && part(6) > 59)) return std::nullopt;
  return s.size() == 8 ? s : s + ":00";
}

// Checks one operand and gives the text kept for it; on a wrong value, `why` says
// what was expected.
std::optional<std::string> readOperand(const std::string& name, const Word& word, std::string& why) {
  const std::string& v = word.text;
  if (name == "N" || name == "COUNT") {
    if (allDigits(v) && (name == "COUNT" || std::stoi(v) >= 1)) return std::to_string(std::stoi(v));
    why = "« " + v + " » n'est pas un nombre" + (name == "N" ? " à partir de 1" : " entier positif");
    return std::nullopt;
  }
  if (name == "DATE") {
    auto day = host::lireJour(v);
    if (day && *day) return v;
    why = "« " + v + " » n'est pas une date (JJ/MM/AAAA)";
    return std::nullopt;
  }
  if (name == "TIME") {
    if (auto time = readTime(v)) return time;
    why = "« " + v + " » n'est pas une heure (HH:MM ou HH:MM:SS)";
    return std::nullopt;
  }
  // Names of modules, objects and actions are never empty; texts and values may be.
  bool mayBeEmpty = name == "TEXT" || name == "VALUE" || name == "CODE";
  if (v.empty() && !mayBeEmpty) {
    why = "nom vide";
    return std::nullopt;
  }
  return v;
}

enum class Fit { No, Wrong, Yes };

Fit fit(const Form& form, const std::vector<Word>& words, Instruction& out, std::string& why) {
  std::vector<std::string> pattern = patternWords(form.pattern);
  if (pattern.size() != words.size()) return Fit::No;
  for (std::size_t i = 0; i < pattern.size(); ++i)
    if (!isOperand(pattern[i]) && (words[i].quoted || words[i].text != pattern[i])) return Fit::No;
  out.op = form.op;
  out.args.clear();
  if (form.kind) out.args.push_back(form.kind);
  for (std::size_t i = 0; i < pattern.size(); ++i) {
    if (!isOperand(pattern[i])) continue;
    auto value = readOperand(pattern[i], words[i], why);
    if (!value) return Fit::Wrong;
    out.args.push_back(*value);
  }
  return Fit::Yes;
}

}  // namespace

std::string ScriptError::describe(const std::string& scriptName) const {
  std::string out = scriptName + ":" + std::to_string(line_) + ": ";
  if (!text_.empty()) out += text_ + " : ";
  return out + what();
}

std::vector<Word> splitWords(int line, std::string_view text) {
  std::vector<Word> words;
  std::size_t i = 0;
  auto blank = [](char c) { return c == ' ' || c == '\t' || c == '\r'; };
  while (i < text.size()) {
    if (blank(text[i])) {
      ++i;
      continue;
    }
    if (text[i] == '#') break;
    Word word;
    if (text[i] == '"') {
      word.quoted = true;
      ++i;
      for (;;) {
        if (i >= text.size()) throw ScriptError(line, std::string(host::text::trim(text)), "guillemet non refermé");
        if (text[i] == '"') {
          if (i + 1 < text.size() && text[i + 1] == '"') {
            word.text += '"';
            i += 2;
            continue;
          }
          ++i;
          break;
        }
        word.text += text[i++];
      }
      if (i < text.size() && !blank(text[i]))
        throw ScriptError(line, std::string(host::text::trim(text)), "un blanc doit suivre le guillemet fermant");
    } else {
      while (i < text.size() && !blank(text[i])) word.text += text[i++];
    }
    words.push_back(std::move(word));
  }
  return words;
}

bool parseLine(int line, std::string_view text, Instruction& out) {
  std::vector<Word> words = splitWords(line, text);
  if (words.empty()) return false;
  // The line as written, up to its comment: what a failure quotes back.
  std::string shown;
  for (const auto& w : words) {
    if (!shown.empty()) shown += ' ';
    if (!w.quoted) {
      shown += w.text;
      continue;
    }
    shown += '"';
    for (char c : w.text) shown += c == '"' ? std::string("\"\"") : std::string(1, c);
    shown += '"';
  }
  out.line = line;
  out.text = shown;
  std::string why;
  for (const Form& form : kForms) {
    std::string wrong;
    Fit f = fit(form, words, out, wrong);
    if (f == Fit::Yes) return true;
    if (f == Fit::Wrong && why.empty()) why = wrong;
  }
  std::string listed;
  for (const Form& form : kForms)
    if (!words[0].quoted && patternWords(form.pattern)[0] == words[0].text)
      listed += (listed.empty() ? "" : " | ") + std::string(form.pattern);
  if (!why.empty()) throw ScriptError(line, shown, why + " ; s'écrit : " + listed);
  if (!listed.empty()) throw ScriptError(line, shown, "forme inconnue ; s'écrit : " + listed);
  std::vector<std::string> verbs;
  for (const Form& form : kForms) {
    std::string verb = patternWords(form.pattern)[0];
    if (std::find(verbs.begin(), verbs.end(), verb) == verbs.end()) verbs.push_back(verb);
  }
  std::string known;
  for (const auto& verb : verbs) known += (known.empty() ? "" : ", ") + verb;
  throw ScriptError(line, shown, "instruction inconnue « " + words[0].text + " » ; instructions : " + known);
}

std::vector<Instruction> parseScript(std::istream& in) {
  std::vector<Instruction> out;
  std::string text;
  int line = 0;
  while (std::getline(in, text)) {
    ++line;
    Instruction instruction;
    if (parseLine(line, text, instruction)) out.push_back(std::move(instruction));
  }
  return out;
}

std::vector<std::string> forms() {
  std::vector<std::string> out;
  for (const Form& form : kForms) out.push_back(form.pattern);
  return out;
}

}  // namespace app
