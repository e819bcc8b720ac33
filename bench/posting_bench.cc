// Posting throughput: client invoices of three lines typed through the entry screen
// "MIRVAE-GESTION1" (client, date, each line's account and amount, line validation,
// "B_VALID_DOC" answered "1"), saved and posted through "MIRVAE-CREER_PIECE_FC" and
// the ledger component, against raw prepared SQLite statements writing the same rows
// (header, lines, piece, movements, due date) in the same run on the same kind of
// fresh demo dossier.
//
// The raw road commits as the screens do (every user action that writes is one
// transaction forced to disk: the piece number drawn at opening, each line's
// identifier, the save), and once more with the whole invoice in one transaction.
// The figure is raw invoices per second / full invoices per second against the first;
// the target is at most 3. The second ratio shows what committing each user action
// costs on the disk of the run.
//
//   MIRVAE_BENCH_INVOICES (1000 invoices per repetition)
//   MIRVAE_BENCH_REPETITIONS (3, interleaved at random)
//   MIRVAE_BENCH_DIR (where the dossiers are made; the temporary directory by default)
#include <cstdio>
#include <iostream>

#include "bench/bench_support.h"
#include "bench/invoice_road.h"

namespace {

const long long kInvoices = bench::size("MIRVAE_BENCH_INVOICES", 1000);
const long long kRepetitions = bench::size("MIRVAE_BENCH_REPETITIONS", 3);

// What both roads must leave in the dossier, checked after each repetition.
std::string expectedSummary;

// Runs `post`, which posts kInvoices invoices, on a fresh demo dossier; only the
// posting is timed, and the dossier is checked afterwards.
template <typename Post>
void postInvoices(benchmark::State& state, Post post) {
  for (auto _ : state) {
    state.PauseTiming();
    auto dossier = std::make_unique<bench::Dossier>("mirvae-posting");
    host::Session& session = dossier->open();
    auto commits = std::make_unique<bench::DossierCommits>(session.base().brut());
    state.ResumeTiming();
    try {
      post(session);
    } catch (const host::HostError& error) {
      state.SkipWithError(error.what());
    }
    state.PauseTiming();
    std::string summary = bench::ledgerSummary(session);
    if (summary != expectedSummary) state.SkipWithError(("left in the dossier: " + summary).c_str());
    state.counters["commits_per_invoice"] =
        static_cast<double>(commits->commits()) / static_cast<double>(kInvoices);
    commits.reset();
    dossier.reset();
    state.ResumeTiming();
  }
  state.SetItemsProcessed(state.iterations() * kInvoices);
}

void BM_PostTypedInvoices(benchmark::State& state) {
  postInvoices(state, [](host::Session& session) {
    for (long long n = 1; n <= kInvoices; ++n) bench::typeInvoice(session);
  });
}

template <bench::Commits commits>
void BM_PostRawInvoices(benchmark::State& state) {
  postInvoices(state, [](host::Session& session) {
    bench::RawWriter writer(session.base().brut(), commits);
    for (long long n = 1; n <= kInvoices; ++n) writer.write(n);
  });
}

BENCHMARK(BM_PostTypedInvoices)->Iterations(1)->Repetitions(kRepetitions)->Unit(benchmark::kMillisecond)->UseRealTime();
BENCHMARK(BM_PostRawInvoices<bench::Commits::AsTheScreens>)
    ->Name("BM_PostRawInvoices")
    ->Iterations(1)
    ->Repetitions(kRepetitions)
    ->Unit(benchmark::kMillisecond)
    ->UseRealTime();
BENCHMARK(BM_PostRawInvoices<bench::Commits::OnePerInvoice>)
    ->Name("BM_PostRawInvoicesOneCommit")
    ->Iterations(1)
    ->Repetitions(kRepetitions)
    ->Unit(benchmark::kMillisecond)
    ->UseRealTime();

}  // namespace

int main(int argc, char** argv) {
  bench::prepareProcess();
  char expected[256];
  std::snprintf(expected, sizeof expected,
                "posted headers %lld, lines %lld, pieces %lld, movements %lld, due dates %lld, debit %.2f, credit %.2f",
                kInvoices, 3 * kInvoices, kInvoices, 7 * kInvoices, kInvoices, 435.42 * kInvoices,
                435.42 * kInvoices);
  expectedSummary = expected;
  std::cout << "each road leaves: " << expectedSummary << "\n";

  bench::Figures figures;
  if (!bench::run(argc, argv, figures)) return 1;
  const char* full = "BM_PostTypedInvoices";
  const char* raw = "BM_PostRawInvoices";
  const char* rawOne = "BM_PostRawInvoicesOneCommit";
  if (!figures.has(full) || !figures.has(raw) || !figures.has(rawOne)) {
    std::cout << "ratio: not measured (every road must run without error)\n";
    return 1;
  }
  auto rate = [&](const char* name) { return static_cast<double>(kInvoices) / figures.seconds(name); };
  auto perInvoice = [&](const char* name) {
    std::printf("  %-28s %8.1f invoices/s, %6.2f ms of processor and %.1f commits forced to disk an invoice, "
                "spread %.0f %% over %zu repetitions\n",
                name, rate(name), figures.cpuSeconds(name) * 1000 / static_cast<double>(kInvoices),
                figures.counter(name, "commits_per_invoice"), figures.spread(name) * 100, figures.repetitions(name));
  };
  std::printf("%lld invoices a repetition, medians:\n", kInvoices);
  for (const char* name : {full, raw, rawOne}) perInvoice(name);
  std::printf("processor ratio full/raw: %.1f\n", figures.cpuSeconds(full) / figures.cpuSeconds(raw));
  std::printf("ratio full/raw with one commit an invoice: %.2f\n", rate(rawOne) / rate(full));
  double ratio = rate(raw) / rate(full);
  std::printf("ratio full/raw: %.2f (target <= 3: %s)\n", ratio, ratio <= 3 ? "met" : "MISSED");
  return 0;
}
