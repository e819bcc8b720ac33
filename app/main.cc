// mirvae: makes dossiers, plays session scripts, runs the demo, prints and exports
// the ledger.
#include <CLI/CLI.hpp>

#include <fstream>
#include <iostream>
#include <sstream>

#include "app/dossier_commands.h"
#include "app/exports.h"
#include "app/print.h"
#include "app/script.h"
#include "app/serve.h"
#include "host/clock.h"
#include "host/error.h"
#include "host/registry.h"
#include "registry/dossier.h"

int main(int argc, char** argv) {
  CLI::App program{"Opérations simplifiées : saisie, contrôle et comptabilisation des opérations courantes"};
  program.require_subcommand(1);

  std::string dossier, script, format = "hledger", output;
  bool demo = false;

  CLI::App* init = program.add_subcommand("init", "Crée un dossier (fichier SQLite)");
  init->add_option("DOSSIER", dossier, "Fichier du dossier à créer")->required();
  init->add_flag("--demo", demo, "Remplit le dossier avec la société de démonstration");

  program.add_subcommand("modules", "Liste les modules enregistrés, dans l'ordre de chargement");

  CLI::App* run = program.add_subcommand("run", "Joue un script de session sur un dossier");
  run->add_option("DOSSIER", dossier, "Dossier")->required()->check(CLI::ExistingFile);
  run->add_option("SCRIPT", script, "Script de session")->required()->check(CLI::ExistingFile);

  CLI::App* demoCommand = program.add_subcommand("demo", "Crée un dossier de démonstration et y saisit une facture client");
  demoCommand->add_option("--dossier", dossier, "Fichier du dossier de démonstration (remplacé s'il existe)");

  CLI::App* ledger = program.add_subcommand("ledger", "Imprime les pièces et mouvements du grand livre");
  ledger->add_option("DOSSIER", dossier, "Dossier")->required()->check(CLI::ExistingFile);

  CLI::App* exportCommand = program.add_subcommand("export", "Exporte le grand livre (hledger) ou le fichier des écritures comptables (fec)");
  exportCommand->add_option("DOSSIER", dossier, "Dossier")->required()->check(CLI::ExistingFile);
  exportCommand->add_option("--format", format, "Format d'export")->check(CLI::IsMember({"hledger", "fec"}));
  exportCommand->add_option("-o,--output", output, "Fichier de sortie (sinon la sortie standard)");

  app::DossierCommands dossierCommands(program, *init, *exportCommand);
  app::PrintRequest print;
  CLI::App* printCommand = program.add_subcommand("print", "Imprime une opération (fiche1 à fiche6) ou une liste (liste1 à liste6) en PDF");
  printCommand->add_option("DOSSIER", print.dossier, "Dossier")->required()->check(CLI::ExistingFile);
  printCommand->add_option("IMPRESSION", print.print, "fiche1 ... fiche6, liste1 ... liste6")->required();
  printCommand->add_option("IDENT", print.ident, "Identifiant de l'opération (fiche)");
  printCommand->add_option("--from", print.from, "Liste : date de début (JJ/MM/AAAA)");
  printCommand->add_option("--to", print.to, "Liste : date de fin (JJ/MM/AAAA)");
  printCommand->add_option("--account", print.account, "Liste : numéro de compte");
  printCommand->add_option("--direction", print.direction, "Liste de banque ou de caisse : D dépenses, R recettes");
  printCommand->add_option("-o,--output", print.output, "Fichier PDF (sinon le dossier d'impressions du dossier)");

  app::ServeOptions serve;
  CLI::App* serveCommand = program.add_subcommand("serve", "Montre les écrans du dossier dans un navigateur");
  serveCommand->add_option("DOSSIER", serve.dossier, "Dossier")->required()->check(CLI::ExistingFile);
  serveCommand->add_option("--port", serve.port, "Port (0 : un port libre)")->check(CLI::Range(0, 65535));
  serveCommand->add_option("--host", serve.host, "Adresse d'écoute");
  serveCommand->add_flag("--allow-remote", serve.allowRemote, "Accepte une adresse d'écoute qui n'est pas locale");

  CLI11_PARSE(program, argc, argv);

  try {
    app::chargerModules();
    if (auto status = dossierCommands.run(std::cout, std::cerr)) return *status;
    if (init->parsed()) {
      registry::creerDossier(dossier, demo, host::clock::today());
      std::cout << "Dossier créé : " << dossier << (demo ? " (démonstration)" : "") << "\n";
      return 0;
    }
    if (program.got_subcommand("modules")) {
      for (const auto& name : host::Registre::instance().modules()) std::cout << name << "\n";
      return 0;
    }
    if (printCommand->parsed()) {
      std::cout << "Impression : " << app::imprimer(print) << "\n";
      return 0;
    }
    if (serveCommand->parsed()) return app::servir(serve, std::cout);
    if (run->parsed()) return app::jouerFichier(dossier, script, std::cout);
    if (demoCommand->parsed()) return app::demo(dossier.empty() ? "demo.db" : dossier, std::cout);
    if (ledger->parsed()) {
      auto db = registry::ouvrirDossier(dossier);
      app::imprimerGrandLivre(*db, std::cout);
      return 0;
    }
    if (exportCommand->parsed()) {
      auto db = registry::ouvrirDossier(dossier);
      // Made whole before the file is opened: a failed export leaves a file as it was.
      std::ostringstream journal;
      app::exporterHledger(*db, journal);
      if (output.empty()) {
        std::cout << journal.str();
      } else {
        std::ofstream file(output);
        file << journal.str();
        if (!file) throw host::HostError("écriture impossible dans « " + output + " »");
      }
      return 0;
    }
  } catch (const std::exception& e) {
    std::cerr << "mirvae : " << e.what() << "\n";
    return 1;
  }
  return 0;
}
