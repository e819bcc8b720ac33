#include "app/dossier_commands.h"

#include <filesystem>
#include <fstream>

#include "app/dossier_setup.h"
#include "app/fec_export.h"
#include "host/clock.h"
#include "host/error.h"
#include "host/value.h"
#include "registry/dossier.h"

namespace app {

DossierCommands::DossierCommands(CLI::App& program, CLI::App& init, CLI::App& exportCommand)
    : init_(&init), export_(&exportCommand) {
  CLI::Option* company = init.add_option("--company", company_,
                                         "Crée le dossier d'une société : plan comptable, TVA, journaux, paramètres")
                             ->excludes(init.get_option("--demo"));
  init.add_option("--exercise-start", exerciseStart_,
                  "Premier jour de l'exercice de douze mois (JJ/MM/AAAA ; 1er janvier de l'année en cours sinon)")
      ->needs(company);
  init.add_option("--currency", currency_, "Devise de tenue du dossier")->capture_default_str()->needs(company);

  set_ = program.add_subcommand("set", "Change une option du dossier (mirvae show les liste)");
  set_->add_option("DOSSIER", dossier_, "Dossier")->required()->check(CLI::ExistingFile);
  set_->add_option("OPTION", option_, "Option")->required();
  set_->add_option("VALUE", value_, "Valeur")->required();

  show_ = program.add_subcommand("show", "Montre la société et les options du dossier");
  show_->add_option("DOSSIER", dossier_, "Dossier")->required()->check(CLI::ExistingFile);

  import_ = program.add_subcommand("import", "Importe des comptes, des tiers ou des cours de devises (CSV)");
  import_->add_option("DOSSIER", dossier_, "Dossier")->required()->check(CLI::ExistingFile);
  import_->add_option("KIND", kind_, "accounts, tiers ou rates")
      ->required()
      ->check(CLI::IsMember({"accounts", "tiers", "rates"}));
  import_->add_option("FILE", file_, "Fichier CSV (UTF-8 ou Windows-1252, séparé par ; ou ,)")
      ->required()
      ->check(CLI::ExistingFile);
  import_->add_flag("--skip-bad", skipBad_, "Écrit les lignes saines et signale les autres");

  exportCommand.add_option("--year", year_, "fec : l'exercice qui se termine cette année (l'exercice en cours sinon)");
  exportCommand.add_option("--separator", separator_, "fec : séparateur des colonnes")
      ->check(CLI::IsMember({"tab", "|"}))
      ->capture_default_str();
}

std::optional<int> DossierCommands::run(std::ostream& out, std::ostream& err) {
  if (init_->parsed() && init_->count("--company")) {
    std::string path = init_->get_option("DOSSIER")->as<std::string>();
    Company company{.name = company_, .exerciseStart = {}, .currency = currency_};
    auto today = host::clock::today();
    company.exerciseStart = std::chrono::year_month_day{today.year(), std::chrono::January, std::chrono::day(1)};
    if (!exerciseStart_.empty()) {
      auto day = host::lireJour(exerciseStart_);
      if (!day || !*day) throw host::HostError("« " + exerciseStart_ + " » n'est pas une date (JJ/MM/AAAA)");
      company.exerciseStart = **day;
    }
    creerSociete(path, company);
    out << "Dossier créé : " << path << " (" << company_ << ")\n";
    return 0;
  }
  if (set_->parsed()) {
    definirOption(*registry::ouvrirDossier(dossier_), option_, value_);
    return 0;
  }
  if (show_->parsed()) {
    afficherOptions(*registry::ouvrirDossier(dossier_), out);
    return 0;
  }
  if (import_->parsed()) {
    ImportKind kind = kind_ == "accounts" ? ImportKind::accounts
                      : kind_ == "tiers"  ? ImportKind::tiers
                                          : ImportKind::rates;
    ImportReport report = importer(*registry::ouvrirDossier(dossier_), kind, file_, skipBad_);
    for (const auto& why : report.refused) err << file_ << " : " << why << "\n";
    if (!report.refused.empty() && !skipBad_) {
      err << "mirvae : " << report.refused.size() << " ligne(s) refusée(s) : rien n'est importé\n";
      return 1;
    }
    out << report.written << " ligne(s) importée(s)";
    if (!report.refused.empty()) out << ", " << report.refused.size() << " refusée(s)";
    out << "\n";
    return 0;
  }
  if (export_->parsed() && export_->count("--format") && export_->get_option("--format")->as<std::string>() == "fec") {
    std::string dossier = export_->get_option("DOSSIER")->as<std::string>();
    FecFile file = exporterFec(*registry::ouvrirDossier(dossier),
                               FecRequest{.year = year_, .separator = separator_ == "|" ? '|' : '\t'});
    std::string target = export_->count("--output") ? export_->get_option("--output")->as<std::string>() : "";
    if (target.empty() || std::filesystem::is_directory(target)) {
      if (file.name.empty()) {
        if (target.empty()) {
          out << file.content;
          return 0;
        }
        throw host::HostError("le dossier n'a pas de SIREN pour nommer le fichier : mirvae set " + dossier +
                              " company_siren ..., ou -o FICHIER");
      }
      target = target.empty() ? file.name : (std::filesystem::path(target) / file.name).string();
    }
    std::ofstream written(target, std::ios::binary);
    written << file.content;
    written.close();
    if (!written) throw host::HostError("écriture impossible dans « " + target + " »");
    out << "Fichier des écritures comptables : " << target << " (" << file.lines << " lignes)\n";
    return 0;
  }
  return std::nullopt;
}

}  // namespace app
