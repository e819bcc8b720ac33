// The commands that set up a real company's dossier and hand its books to the tax
// office: `init --company`, `set`, `show`, `import` and `export --format fec`.
#pragma once

#include <CLI/CLI.hpp>
#include <optional>
#include <ostream>
#include <string>

namespace app {

class DossierCommands {
 public:
  // Adds `set`, `show` and `import` to `program`, the company options to `init` and
  // the FEC options to `exportCommand`.
  DossierCommands(CLI::App& program, CLI::App& init, CLI::App& exportCommand);

  // Runs the command parsed when it is one of these; nothing otherwise. Throws
  // HostError as the other commands do.
  std::optional<int> run(std::ostream& out, std::ostream& err);

 private:
  CLI::App *init_, *export_, *set_, *show_, *import_;
  std::string dossier_, company_, exerciseStart_, currency_ = "EUR";
  std::string option_, value_, kind_, file_, separator_ = "tab";
  std::optional<int> year_;
  bool skipBad_ = false;
};

}  // namespace app
