// What the benchmark programs share: sizes read from the environment, fresh demo
// dossiers with a session open on them, the user who answers the validation dialog,
// peak memory, and the figures of a run, from which each program prints its ratio on
// its last line.
//
// Every figure is compared with a baseline measured in the same run: these machines
// are shared and noisy, and only a ratio survives that.
#pragma once

#include <benchmark/benchmark.h>
#include <sqlite3.h>
#include <sys/resource.h>
#include <unistd.h>

#include <algorithm>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <map>
#include <memory>
#include <string>
#include <vector>

#include "host/clock.h"
#include "host/error.h"
#include "host/session.h"
#include "registry/dossier.h"
#include "registry/library.h"
#include "services/services.h"

namespace bench {

// A size from the environment (MIRVAE_BENCH_...), or `fallback` when unset. A value
// that is not a positive whole number stops the program: a benchmark run on a size
// nobody asked for would report figures nobody can compare.
inline long long size(const char* variable, long long fallback) {
  const char* text = std::getenv(variable);
  if (!text || !*text) return fallback;
  char* end = nullptr;
  long long n = std::strtoll(text, &end, 10);
  if (*end != '\0' || n <= 0) {
    std::fprintf(stderr, "%s=%s: a positive whole number is expected\n", variable, text);
    std::exit(2);
  }
  return n;
}

// The day the benchmarks work on: the demo dossier's exercise is its calendar year.
inline std::chrono::year_month_day today() {
  using namespace std::chrono;
  return year_month_day{year(2024), month(3), day(15)};
}

// Loads the library and fixes the clock; once per process.
inline void prepareProcess() {
  registry::chargerBibliotheque();
  services::chargerServices();
  host::clock::setToday(today());
  host::clock::setTimeOfDay("10:30:00");
}

// Where dossiers are made: MIRVAE_BENCH_DIR, or the temporary directory. The disk
// matters (each saved invoice is one commit), so the README says which was used.
inline std::string dossierPath(const std::string& stem) {
  static int counter = 0;
  const char* dir = std::getenv("MIRVAE_BENCH_DIR");
  std::filesystem::path base = dir && *dir ? std::filesystem::path(dir) : std::filesystem::temp_directory_path();
  return (base / (stem + "-" + std::to_string(::getpid()) + "-" + std::to_string(counter++) + ".db")).string();
}

inline void removeDossier(const std::string& path) {
  for (const char* suffix : {"", "-wal", "-shm", "-journal"}) std::filesystem::remove(path + suffix);
}

// The user of the benchmarks: answers every validation dialog with "1" (save), as
// if that answer had been given in advance for each invoice. Any other question is
// unexpected, and an error that names it: a benchmark that silently answered would
// measure a road nobody asked for.
class ValidatingUser : public host::UserAgent {
 public:
  bool oui(const std::string& question) override {
    throw host::HostError("question inattendue pendant la mesure : « " + question + " »");
  }
  std::string dialogue(const std::string&, const std::string&, const std::vector<std::string>&) override {
    return saveChoice;
  }
  std::optional<std::string> choisir(const std::string& window, const std::vector<std::string>&) override {
    throw host::HostError("fenêtre de choix inattendue pendant la mesure : « " + window + " »");
  }
  void piloter(host::Session&, host::Automate&) override {}

  // The save dialog's answer: "1" saves, "2" saves and starts the next operation on
  // the same screen.
  std::string saveChoice = "1";
};

// `count` operations, the six kinds in turn, `kPerMonth` of each kind a month going
// back from March 2024; nine client invoices in ten posted (a PIECE row, half of
// them final), the clients of the demo dossier in turn, bank and cash operations on
// the accounts their browsers open on, and one ledger movement of each on its account.
inline void fillWithOperations(host::Database& db, long long count, long long kPerMonth) {
  db.begin();
  host::Statement& operations = db.prepare(R"(
    WITH RECURSIVE n(i) AS (SELECT 0 UNION ALL SELECT i + 1 FROM n WHERE i + 1 < ?1)
    INSERT INTO MIRVAE (IDENT, TYPE, DTOPE, NUMCP, NUMJL, NPIEC, INPIE, NPIES, MONNAIE_IDENT, COURS,
                        DTECH, SAISIE_MTT, HT, TVA, TTC, DATEC, USERM)
    SELECT printf('%08d', i + 1), kind,
           date('2024-03-01', printf('-%d months', (i / 6) / ?2), printf('+%d days', (i / 6) % 28)),
           CASE kind WHEN 'FC' THEN printf('41100%d', 1 + (i / 6) % 6) WHEN 'BQ' THEN '512100'
                     WHEN 'CA' THEN '530000' ELSE '401001' END,
           CASE kind WHEN 'FC' THEN 'VT' ELSE 'OD' END,
           printf('VT%06d', i / 6), printf('Facture client n° VT%06d', i / 6),
           CASE WHEN kind = 'FC' AND (i / 6) % 10 <> 9 THEN printf('%011d', i + 1) ELSE '' END,
           'EUR', 1, '2024-04-30', '1', '300', '60', '360', '2024-03-15', 'banc'
    FROM (SELECT i, CASE i % 6 WHEN 0 THEN 'FC' WHEN 1 THEN 'FF' WHEN 2 THEN 'NDF' WHEN 3 THEN 'BQ'
                                 WHEN 4 THEN 'CA' ELSE 'OD' END AS kind FROM n)
  )");
  operations.bind(1, count).bind(2, kPerMonth);
  operations.step();
  operations.reset();
  db.exec(R"(
    INSERT INTO PIECE (NPIES, NPIEC, NUMJL, DTOPE, IMPUT)
    SELECT NPIES, NPIEC, NUMJL, DTOPE, CASE WHEN CAST(IDENT AS INTEGER) % 12 = 1 THEN 'O' ELSE '' END
    FROM MIRVAE WHERE NPIES <> ''
  )");
  // One movement of each operation on its account, so that an account's sums (the
  // bank and cash balances) read a ledger of the dossier's size.
  db.exec(R"(
    INSERT INTO MOUVE (UNIQ, NPIES, NLIGS, NUMCP, NUMJL, DTOPE, LIBEC, MONNAIE_IDENT, MTDEBS, MTCRES, MTDEB, MTCRE,
                       INDX2)
    SELECT rowid, printf('%011d', rowid), printf('%011d0001', rowid), NUMCP, NUMJL, DTOPE, INPIE, 'EUR', TTC, '0',
           TTC, '0', NUMCP || '|' || DTOPE
    FROM MIRVAE
  )");
  db.commit();
}

// A fresh demo dossier, removed with the object, and a session on it.
class Dossier {
 public:
  explicit Dossier(const std::string& stem) : path_(dossierPath(stem)) {
    prepareProcess();
    registry::creerDossier(path_, true, today());
  }
  ~Dossier() {
    close();
    removeDossier(path_);
  }
  Dossier(const Dossier&) = delete;
  Dossier& operator=(const Dossier&) = delete;

  const std::string& path() const { return path_; }
  host::Session& open() {
    if (!session_) session_ = std::make_unique<host::Session>(registry::ouvrirDossier(path_), user_, "banc");
    return *session_;
  }
  void close() { session_.reset(); }
  host::Session& session() { return *session_; }
  ValidatingUser& user() { return user_; }

 private:
  std::string path_;
  ValidatingUser user_;
  std::unique_ptr<host::Session> session_;
};

// Counts the commits that wrote to the dossier file on a connection: each is forced
// to disk before the user goes on, and on most disks that wait is what a commit
// costs. Changes to the session's private tables do not count.
class DossierCommits {
 public:
  explicit DossierCommits(sqlite3* db) : db_(db) {
    sqlite3_update_hook(
        db_,
        [](void* self, int, const char* database, const char*, sqlite3_int64) {
          if (std::string(database) == "main") static_cast<DossierCommits*>(self)->changed_ = true;
        },
        this);
    sqlite3_commit_hook(
        db_,
        [](void* self) {
          auto* counter = static_cast<DossierCommits*>(self);
          if (counter->changed_) ++counter->commits_;
          counter->changed_ = false;
          return 0;
        },
        this);
    sqlite3_rollback_hook(db_, [](void* self) { static_cast<DossierCommits*>(self)->changed_ = false; }, this);
  }
  ~DossierCommits() {
    sqlite3_update_hook(db_, nullptr, nullptr);
    sqlite3_commit_hook(db_, nullptr, nullptr);
    sqlite3_rollback_hook(db_, nullptr, nullptr);
  }
  DossierCommits(const DossierCommits&) = delete;
  DossierCommits& operator=(const DossierCommits&) = delete;
  long long commits() const { return commits_; }

 private:
  sqlite3* db_;
  bool changed_ = false;
  long long commits_ = 0;
};

// Peak resident memory of this process in kB (VmHWM), 0 when the system does not say.
inline long long peakMemoryKb() {
  std::ifstream status("/proc/self/status");
  std::string line;
  while (std::getline(status, line))
    if (line.rfind("VmHWM:", 0) == 0) return std::atoll(line.c_str() + 6);
  struct rusage usage {};
  getrusage(RUSAGE_SELF, &usage);
  return usage.ru_maxrss;
}

// Shows the runs as the console reporter does, and keeps the real time of each run
// (seconds per iteration) and its counters, by benchmark name without repetitions.
class Figures : public benchmark::ConsoleReporter {
 public:
  void ReportRuns(const std::vector<Run>& runs) override {
    ConsoleReporter::ReportRuns(runs);
    for (const Run& run : runs) {
      if (run.error_occurred || run.run_type != Run::RT_Iteration || run.iterations == 0) continue;
      std::string name = run.run_name.function_name + (run.run_name.args.empty() ? "" : "/" + run.run_name.args);
      seconds_[name].push_back(run.real_accumulated_time / static_cast<double>(run.iterations));
      cpu_[name].push_back(run.cpu_accumulated_time / static_cast<double>(run.iterations));
      for (const auto& [counter, value] : run.counters) counters_[name][counter].push_back(value.value);
    }
  }

  bool has(const std::string& name) const { return seconds_.count(name) > 0; }
  // Median over the repetitions of the real time of one iteration, in seconds.
  double seconds(const std::string& name) const { return median(seconds_.at(name)); }
  // Median over the repetitions of the processor time of one iteration, in seconds.
  double cpuSeconds(const std::string& name) const { return median(cpu_.at(name)); }
  // Median over the repetitions of a counter.
  double counter(const std::string& name, const std::string& counter) const {
    return median(counters_.at(name).at(counter));
  }
  std::size_t repetitions(const std::string& name) const { return seconds_.at(name).size(); }
  // Spread of the repetitions: (slowest - fastest) / median.
  double spread(const std::string& name) const {
    const auto& v = seconds_.at(name);
    return (*std::max_element(v.begin(), v.end()) - *std::min_element(v.begin(), v.end())) / median(v);
  }

 private:
  static double median(std::vector<double> v) {
    std::sort(v.begin(), v.end());
    std::size_t n = v.size();
    return n % 2 ? v[n / 2] : (v[n / 2 - 1] + v[n / 2]) / 2;
  }
  std::map<std::string, std::vector<double>> seconds_, cpu_;
  std::map<std::string, std::map<std::string, std::vector<double>>> counters_;
};

// Runs the registered benchmarks with `figures` as the console reporter. With
// `interleave`, repetitions of different benchmarks are interleaved at random unless
// the command line says otherwise, so that a burst of load elsewhere falls on both
// sides of a ratio. Returns false when the command line was wrong or nothing ran.
inline bool run(int argc, char** argv, Figures& figures, bool interleave = true) {
  std::vector<char*> args(argv, argv + argc);
  std::string interleaving = "--benchmark_enable_random_interleaving=true";
  bool chosen = false;
  for (int i = 1; i < argc; ++i)
    chosen = chosen || std::string(argv[i]).rfind("--benchmark_enable_random_interleaving", 0) == 0;
  if (interleave && !chosen) args.push_back(interleaving.data());
  int count = static_cast<int>(args.size());
  benchmark::Initialize(&count, args.data());
  if (benchmark::ReportUnrecognizedArguments(count, args.data())) return false;
  std::size_t ran = benchmark::RunSpecifiedBenchmarks(&figures);
  benchmark::Shutdown();
  std::fflush(stdout);
  return ran > 0;
}

}  // namespace bench
