// Memory: the peak memory of one session typing 10,000 client invoices, and of one
// typing 100,000. Each size runs in a child process of its own, so that the peaks do
// not mix; the figure is peak(100,000) / peak(10,000), and the target is at most 1.1:
// what a session keeps must not grow with the work it has done.
//
// The road, MIRVAE_BENCH_MEMORY_ROAD:
//   typed (default)  every invoice is typed on one client-invoice entry screen kept
//                    open the whole session, saved with "2" (save and start the next
//                    one), and posted, as an accountant enters a pile of invoices;
//   posting          the invoices are saved with raw SQL (header and three lines, as
//                    the entry screen leaves them), then each is posted through
//                    "MIRVAE-CREER_PIECE_FC" and the ledger component as one user
//                    action: the posting alone, in a fraction of the time.
//
//   MIRVAE_BENCH_MEMORY_SMALL (10000)  MIRVAE_BENCH_MEMORY_LARGE (100000)
//   MIRVAE_BENCH_DIR (where the dossiers are made)
#include <cstdio>
#include <cstring>
#include <filesystem>
#include <iostream>

#include "bench/bench_support.h"
#include "bench/invoice_road.h"

namespace {

const long long kSmall = bench::size("MIRVAE_BENCH_MEMORY_SMALL", 10000);
const long long kLarge = bench::size("MIRVAE_BENCH_MEMORY_LARGE", 100000);

std::string road() {
  const char* chosen = std::getenv("MIRVAE_BENCH_MEMORY_ROAD");
  std::string name = chosen && *chosen ? chosen : "typed";
  if (name != "posting" && name != "typed") {
    std::fprintf(stderr, "MIRVAE_BENCH_MEMORY_ROAD=%s: posting or typed is expected\n", name.c_str());
    std::exit(2);
  }
  return name;
}

const char kChildFlag[] = "--memory-child=";

// The child: one session on a fresh dossier posts `count` invoices. Prints one line,
// "<peak kB before posting> <peak kB after> <seconds posting> <transcript entries>",
// then the dossier's summary.
int child(long long count) {
  bench::Dossier dossier("mirvae-memory");
  host::Session& session = dossier.open();
  bool typed = road() == "typed";
  if (typed) dossier.user().saveChoice = "2";
  if (!typed) bench::writeSavedInvoices(session.base(), count);
  long long before = bench::peakMemoryKb();
  auto start = std::chrono::steady_clock::now();
  for (long long n = 1; n <= count; ++n) {
    if (typed)
      bench::typeInvoice(session, true);
    else
      bench::postSavedInvoice(session, n);
  }
  std::chrono::duration<double> took = std::chrono::steady_clock::now() - start;
  long long after = bench::peakMemoryKb();
  std::printf("%lld %lld %.3f %zu\n%s\n", before, after, took.count(), session.transcript().entrees().size(),
              bench::ledgerSummary(session).c_str());
  return 0;
}

struct ChildResult {
  long long peakBeforeKb = 0, peakKb = 0;
  double seconds = 0;
  long long transcript = 0;
  std::string summary;
};

// Runs this program again as a child posting `count` invoices.
std::optional<ChildResult> runChild(long long count) {
  std::string self = std::filesystem::read_symlink("/proc/self/exe").string();
  std::string command = "'" + self + "' " + kChildFlag + std::to_string(count);
  FILE* pipe = popen(command.c_str(), "r");
  if (!pipe) return std::nullopt;
  ChildResult result;
  char line[1024];
  bool read = std::fgets(line, sizeof line, pipe) &&
              std::sscanf(line, "%lld %lld %lf %lld", &result.peakBeforeKb, &result.peakKb, &result.seconds,
                          &result.transcript) == 4;
  if (read && std::fgets(line, sizeof line, pipe)) result.summary = std::string(line, std::strcspn(line, "\n"));
  int status = pclose(pipe);
  if (!read || status != 0) return std::nullopt;
  return result;
}

std::map<long long, ChildResult> results;

void BM_PeakMemory(benchmark::State& state) {
  const long long count = state.range(0);
  for (auto _ : state) {
    std::optional<ChildResult> result = runChild(count);
    if (!result) {
      state.SkipWithError("the child process failed");
      return;
    }
    state.SetIterationTime(result->seconds);
    results[count] = *result;
  }
  const ChildResult& r = results[count];
  state.counters["peak_MB"] = static_cast<double>(r.peakKb) / 1024;
  state.counters["peak_before_MB"] = static_cast<double>(r.peakBeforeKb) / 1024;
  state.counters["transcript"] = static_cast<double>(r.transcript);
  state.SetItemsProcessed(state.iterations() * count);
}
BENCHMARK(BM_PeakMemory)->Arg(kSmall)->Arg(kLarge)->Iterations(1)->UseManualTime()->Unit(benchmark::kSecond);

}  // namespace

int main(int argc, char** argv) {
  for (int i = 1; i < argc; ++i)
    if (std::strncmp(argv[i], kChildFlag, std::strlen(kChildFlag)) == 0)
      return child(std::atoll(argv[i] + std::strlen(kChildFlag)));
  std::cout << "road: " << road() << "\n" << std::flush;

  bench::Figures figures;
  if (!bench::run(argc, argv, figures, false)) return 1;
  if (!results.count(kSmall) || !results.count(kLarge)) {
    std::cout << "ratio: not measured (both sizes must run)\n";
    return 1;
  }
  for (long long count : {kSmall, kLarge})
    std::cout << count << " invoices: " << results[count].summary << "\n";
  const ChildResult& small = results[kSmall];
  const ChildResult& large = results[kLarge];
  std::printf("peak memory: %.1f MB after %lld invoices (%.1f MB before posting), %.1f MB after %lld (%.1f MB "
              "before); transcript entries %lld and %lld\n",
              small.peakKb / 1024.0, kSmall, small.peakBeforeKb / 1024.0, large.peakKb / 1024.0, kLarge,
              large.peakBeforeKb / 1024.0, small.transcript, large.transcript);
  double ratio = static_cast<double>(large.peakKb) / static_cast<double>(small.peakKb);
  std::printf("ratio peak large/small: %.2f (target <= 1.1: %s)\n", ratio, ratio <= 1.1 ? "met" : "MISSED");
  return 0;
}
