// Posting throughput: client invoices of three lines typed through the entry screen
// "MIRVAE-GESTION1" (client, date, each line's account and amount, line validation,
// "B_VALID_DOC" answered "1"), saved and posted through "MIRVAE-CREER_PIECE_FC" and
// the ledger component, against raw prepared SQLite statements writing the same rows
// (counters, header, lines, piece, movements, due date) in the same run on the same
// kind of fresh demo dossier, one transaction an invoice forced to the disk.
// The figure is raw invoices per second / typed invoices per second; the target is at
// most 2.
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

// Runs `post`, which posts kInvoices invoices on a fresh demo dossier and returns how
// many writes it forced to the disk; only the posting is timed, and the dossier is
// checked afterwards.
template <typename Post>
void postInvoices(benchmark::State& state, Post post) {
  for (auto _ : state) {
    state.PauseTiming();
    auto dossier = std::make_unique<bench::Dossier>("mirvae-posting");
    host::Session& session = dossier->open();
    auto commits = std::make_unique<bench::DossierCommits>(session.base().brut());
    state.ResumeTiming();
    long long forced = 0;
    try {
      forced = post(session);
    } catch (const host::HostError& error) {
      state.SkipWithError(error.what());
    }
    state.PauseTiming();
    std::string summary = bench::ledgerSummary(session);
    if (summary != expectedSummary) state.SkipWithError(("left in the dossier: " + summary).c_str());
    state.counters["commits_per_invoice"] =
        static_cast<double>(commits->commits()) / static_cast<double>(kInvoices);
    state.counters["forced_per_invoice"] = static_cast<double>(forced) / static_cast<double>(kInvoices);
    commits.reset();
    dossier.reset();
    state.ResumeTiming();
  }
  state.SetItemsProcessed(state.iterations() * kInvoices);
}

void BM_PostTypedInvoices(benchmark::State& state) {
  postInvoices(state, [](host::Session& session) {
    long long before = session.base().ecrituresForcees();
    for (long long n = 1; n <= kInvoices; ++n) bench::typeInvoice(session);
    return session.base().ecrituresForcees() - before;
  });
}

void BM_PostRawInvoices(benchmark::State& state) {
  postInvoices(state, [](host::Session& session) {
    bench::RawWriter writer(session.base().brut());
    for (long long n = 1; n <= kInvoices; ++n) writer.write(n);
    return kInvoices;  // every commit is forced
  });
}

BENCHMARK(BM_PostTypedInvoices)->Iterations(1)->Repetitions(kRepetitions)->Unit(benchmark::kMillisecond)->UseRealTime();
BENCHMARK(BM_PostRawInvoices)->Iterations(1)->Repetitions(kRepetitions)->Unit(benchmark::kMillisecond)->UseRealTime();

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
  if (!figures.has(full) || !figures.has(raw)) {
    std::cout << "ratio: not measured (every road must run without error)\n";
    return 1;
  }
  auto rate = [&](const char* name) { return static_cast<double>(kInvoices) / figures.seconds(name); };
  std::printf("%lld invoices a repetition, medians:\n", kInvoices);
  for (const char* name : {full, raw})
    std::printf("  %-22s %8.1f invoices/s, %6.2f ms of processor, %.1f commits and %.1f forced writes an invoice, "
                "spread %.0f %% over %zu repetitions\n",
                name, rate(name), figures.cpuSeconds(name) * 1000 / static_cast<double>(kInvoices),
                figures.counter(name, "commits_per_invoice"), figures.counter(name, "forced_per_invoice"),
                figures.spread(name) * 100, figures.repetitions(name));
  std::printf("processor ratio typed/raw: %.1f\n", figures.cpuSeconds(full) / figures.cpuSeconds(raw));
  double ratio = rate(raw) / rate(full);
  std::printf("ratio typed/raw: %.2f (target <= 2: %s)\n", ratio, ratio <= 2 ? "met" : "MISSED");
  return 0;
}
