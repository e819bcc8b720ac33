// List print: the client-invoice list "liste1" of 2,000 operations printed through the
// interface's "IMPRESSION", as the browser asks for it, written as a PDF file.
//
// The baseline is the same print job kept in memory (no destination): the job reads
// the request, fills its variables and reads each row's account, but nothing is laid
// out. The ratio PDF / job says what laying the document out and writing it costs
// over the job itself; the figure that matters to a person is the time of the PDF.
//
//   MIRVAE_BENCH_PRINT_ROWS (2000)   MIRVAE_BENCH_REPETITIONS (5)
#include <iostream>

#include "bench/bench_support.h"
#include "host/automate.h"
#include "host/event.h"
#include "host/registry.h"
#include "model/impression.h"

namespace {

const long long kRows = bench::size("MIRVAE_BENCH_PRINT_ROWS", 2000);
const long long kRepetitions = bench::size("MIRVAE_BENCH_REPETITIONS", 5);

// `count` client invoices of March 2024, the clients of the demo dossier in turn, a
// label long enough to wrap now and then.
void generate(host::Database& db, long long count) {
  db.begin();
  host::Statement& operations = db.prepare(R"(
    WITH RECURSIVE n(i) AS (SELECT 0 UNION ALL SELECT i + 1 FROM n WHERE i + 1 < ?1)
    INSERT INTO MIRVAE (IDENT, TYPE, DTOPE, NUMCP, NUMJL, NPIEC, INPIE, MONNAIE_IDENT, COURS, HT, TVA, TTC)
    SELECT printf('%08d', i + 1), 'FC', date('2024-03-01', printf('+%d days', i % 28)),
           printf('41100%d', 1 + i % 6), 'VT', printf('VT%06d', i),
           CASE WHEN i % 7 = 0 THEN printf('Facture client n° VT%06d, pose et fournitures du chantier de rénovation', i)
                ELSE printf('Facture client n° VT%06d', i) END,
           'EUR', 1, printf('%d.50', 1000 + i), printf('%d.10', 200 + i), printf('%d.60', 1200 + 2 * i)
    FROM n
  )");
  operations.bind(1, count);
  operations.step();
  operations.reset();
  db.commit();
}

bench::Dossier& dossier() {
  static std::unique_ptr<bench::Dossier> made;
  if (!made) {
    made = std::make_unique<bench::Dossier>("mirvae-print");
    generate(made->open().base(), kRows);
  }
  return *made;
}

const std::string kRequest = "Select * From \"MIRVAE\" Where TYPE = 'FC' And DTOPE >= '2024-03-01' And "
                             "DTOPE <= '2024-03-31' Order By TYPE, DTOPE, NPIEC, IDENT";

void print(host::Session& session) {
  bool printed = session.action([&] {
    host::AutomatePtr caller = host::Registre::instance().creer("MIRVAE-INTERFACE", nullptr);
    host::Chaine name("liste1"), sql(kRequest);
    host::EvtParamRef evt(2, &name, &sql);
    caller->appelerProcedure("*", "MIRVAE", "INTERFACE", "IMPRESSION", &evt, -1);
  });
  if (!printed) throw host::HostError("impression en échec : " + session.transcript().rendu());
  session.transcript().vider();
}

void BM_PrintList(benchmark::State& state) {
  host::Session& session = dossier().open();
  const bool pdf = state.range(0) == 1;
  const std::string file = dossier().path() + ".pdf";
  model::DestinationGuard guard;
  if (pdf) model::Imprimante::courante().versFichier(file);
  print(session);  // warms the page cache and the statements
  for (auto _ : state) print(session);
  state.counters["rows"] = static_cast<double>(model::Imprimante::courante().derniere().blocks.size());
  if (pdf) {
    state.counters["kB"] = static_cast<double>(std::filesystem::file_size(file)) / 1024;
    std::filesystem::remove(file);
  }
}
BENCHMARK(BM_PrintList)
    ->Arg(1)
    ->Arg(0)
    ->Iterations(1)
    ->Repetitions(kRepetitions)
    ->Unit(benchmark::kMillisecond)
    ->UseRealTime();

}  // namespace

int main(int argc, char** argv) {
  bench::prepareProcess();
  dossier();
  bench::Figures figures;
  if (!bench::run(argc, argv, figures)) return 1;
  if (!figures.has("BM_PrintList/1") || !figures.has("BM_PrintList/0")) {
    std::cout << "ratio: not measured (both roads must run)\n";
    return 1;
  }
  double pdf = figures.seconds("BM_PrintList/1") * 1000, job = figures.seconds("BM_PrintList/0") * 1000;
  std::printf("list of %lld operations: %.0f ms as PDF (%.0f kB), %.0f ms for the job alone; spread %.0f %% / %.0f %%\n",
              kRows, pdf, figures.counter("BM_PrintList/1", "kB"), job, figures.spread("BM_PrintList/1") * 100,
              figures.spread("BM_PrintList/0") * 100);
  std::printf("ratio pdf/job: %.2f\n", pdf / job);
  return 0;
}
