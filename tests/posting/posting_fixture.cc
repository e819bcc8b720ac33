#include "tests/posting/posting_fixture.h"

#include <map>

#include "host/automate.h"
#include "host/decimal.h"
#include "host/registry.h"
#include "services/cppiece.h"
#include "services/ledger.h"

namespace testing_support {

namespace {

using host::Decimal;

Decimal montant(const std::string& text) { return text.empty() ? Decimal() : *Decimal::parse(text); }

void inserer(host::Database& db, const std::string& sql, const std::vector<std::string>& values) {
  host::Statement& s = db.prepare(sql);
  for (std::size_t i = 0; i < values.size(); ++i) s.bind(static_cast<int>(i) + 1, values[i]);
  s.step();
  s.reset();
}

}  // namespace

void PostingTest::SetUp() {
  DossierTest::SetUp();
  services::importTestHooks() = {};
  services::importTestHooks().onCall = [this](const std::string& procedure, const std::string& account) {
    appels_.push_back(account.empty() ? procedure : procedure + " " + account);
  };
}

void PostingTest::TearDown() {
  services::importTestHooks() = {};
  std::map<std::string, Decimal> balance, balanceInPieceCurrency;
  host::Statement& s = base().prepare("SELECT NPIES, MTDEB, MTCRE, MTDEBS, MTCRES FROM MOUVE");
  while (s.step()) {
    balance[s.text(0)] += montant(s.text(1)) - montant(s.text(2));
    balanceInPieceCurrency[s.text(0)] += montant(s.text(3)) - montant(s.text(4));
  }
  s.reset();
  for (const auto& [piece, rest] : balance) EXPECT_TRUE(rest.isZero()) << "pièce " << piece << " déséquilibrée";
  for (const auto& [piece, rest] : balanceInPieceCurrency)
    EXPECT_TRUE(rest.isZero()) << "pièce " << piece << " déséquilibrée en monnaie de pièce";
  DossierTest::TearDown();
}

void PostingTest::ecrire(const OperationEssai& op) {
  Decimal ht, tva;
  for (std::size_t i = 0; i < op.lignes.size(); ++i) {
    const LigneEssai& l = op.lignes[i];
    ht += montant(l.ht);
    tva += montant(l.tva);
    std::string order = std::to_string(i + 1);
    std::string ident = op.ident + "-" + order;
    inserer(base(),
            "INSERT INTO MIRVAL (IDENT, NUMERO, NUMCP, LIBEC, COTVA, HT, TVA, TTC, SENS_DC) "
            "VALUES (?, ?, ?, 'ligne', ?, ?, ?, ?, ?)",
            {ident, op.ident + "|" + std::string(6 - order.size(), '0') + order, l.numcp, l.cotva, l.ht, l.tva,
             l.ttc.empty() ? (montant(l.ht) + montant(l.tva)).toString(0) : l.ttc, l.sensDc});
    for (std::size_t a = 0; a < l.ventilation.size(); ++a)
      inserer(base(), "INSERT INTO MIRVAANA (IDENT, NUMERO, CSECT, MTADE, MTACR) VALUES (?, ?, ?, ?, ?)",
              {ident + "A" + std::to_string(a), ident + "|", l.ventilation[a][0], l.ventilation[a][1],
               l.ventilation[a][2]});
  }
  std::string ttc = op.ttc.empty() ? (ht + tva).toString(0) : op.ttc;
  inserer(base(),
          "INSERT INTO MIRVAE (IDENT, TYPE, DTOPE, NUMCP, NUMJL, NPIEC, INPIE, NPIES, MONNAIE_IDENT, COURS, DTECH, "
          "SAISIE_MTT, HT, TVA, TTC, TYPE_DR) VALUES (?, ?, ?, ?, ?, 'VT0042', 'Facture client n° VT0042', ?, ?, ?, "
          "'2024-04-14', '1', ?, ?, ?, ?)",
          {op.ident, op.type, op.dtope, op.numcp, op.numjl, op.npies, op.monnaie, op.cours, ht.toString(0),
           tva.toString(0), ttc, op.typeDr});
}

void PostingTest::lancer(const char* module, host::Evt& evt) {
  session().action([&] { session().executer(host::Registre::instance().creer(module, &evt)); });
}

void PostingTest::poster(const std::string& ident, const std::string& type) {
  host::EvtParamVal evt(1, ident);
  lancer(("MIRVAE-CREER_PIECE_" + type).c_str(), evt);
}

std::string PostingTest::npies(const std::string& ident) {
  host::Statement& s = base().prepare("SELECT NPIES FROM MIRVAE WHERE IDENT = ?");
  s.bind(1, ident);
  std::string value = s.step() ? s.text(0) : std::string();
  s.reset();
  return value;
}

std::vector<std::string> PostingTest::mouvements(const std::string& piece) {
  std::vector<std::string> out;
  host::Statement& s = base().prepare("SELECT NUMCP, MTDEB, MTCRE FROM MOUVE WHERE NPIES = ? ORDER BY NLIGS");
  s.bind(1, piece);
  while (s.step()) {
    Decimal debit = montant(s.text(1)), credit = montant(s.text(2));
    bool onDebit = !debit.isZero() || credit.isZero();
    out.push_back(s.text(0) + (onDebit ? " D " : " C ") + (onDebit ? debit : credit).toString(2));
  }
  s.reset();
  return out;
}

std::vector<std::string> PostingTest::lignesEnvoyees() const {
  std::vector<std::string> out;
  for (const auto& call : appels_)
    if (call.rfind("DEBUT_LIGNE", 0) == 0) out.push_back(call.size() > 12 ? call.substr(12) : "");
  return out;
}

std::vector<std::string> PostingTest::messages() { return session().transcript().textes("message"); }

long long PostingTest::compte(const std::string& query) { return std::stoll(sql(query)); }

}  // namespace testing_support
