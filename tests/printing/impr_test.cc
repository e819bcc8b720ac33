// The form and list prints of the six kinds on the demo dossier: the values each job
// fills, and the PDF files read back as a person would see them.
#include <gtest/gtest.h>

#include <algorithm>
#include <cctype>
#include <cstdio>
#include <filesystem>

#include "host/error.h"
#include "host/registry.h"
#include "host/session.h"
#include "model/impression.h"
#include "model/interface.h"
#include "tests/support/fixture.h"

namespace {

using host::Chaine;
using model::valueOf;
using testing_support::inOrder;

std::string withoutBlanks(std::string text) {
  text.erase(std::remove_if(text.begin(), text.end(), [](unsigned char c) { return std::isspace(c); }), text.end());
  return text;
}

class ImprTest : public testing_support::DossierTest {
 protected:
  void SetUp() override {
    DossierTest::SetUp();
    pdf_ = testing_support::cheminTemporaire("mirvae-print") + ".pdf";
    model::Imprimante::courante().vider();
  }
  void TearDown() override {
    model::Imprimante::courante().nullePart();
    std::filesystem::remove(pdf_);
    DossierTest::TearDown();
  }
  // An operation of `type` with one line per account of `lines`, each 100 excluding tax at 20 %.
  void operation(const std::string& ident, const std::string& type, const std::string& numcp,
                 const std::vector<std::string>& lines, const std::string& label = "Opération",
                 const std::string& direction = "", const std::string& day = "2024-03-10") {
    host::Statement& s = base().prepare(
        "INSERT INTO MIRVAE (IDENT, TYPE, DTOPE, NUMCP, NUMJL, NPIEC, INPIE, MONNAIE_IDENT, HT, TVA, TTC, TYPE_DR,"
        " DEBPIS, CREPIS) VALUES (?, ?, ?, ?, 'VT', ?, ?, 'EUR', ?, ?, ?, ?, ?, ?)");
    std::string ht = std::to_string(100 * lines.size()), tva = std::to_string(20 * lines.size()),
                ttc = std::to_string(120 * lines.size());
    s.bind(1, ident).bind(2, type).bind(3, day).bind(4, numcp).bind(5, "P" + ident).bind(6, label);
    s.bind(7, ht).bind(8, tva).bind(9, ttc).bind(10, direction).bind(11, ht).bind(12, ht);
    s.step();
    s.reset();
    for (std::size_t i = 0; i < lines.size(); ++i) {
      char numero[32];
      std::snprintf(numero, sizeof numero, "%s|%06zu", ident.c_str(), i + 1);
      base().exec("INSERT INTO MIRVAL (IDENT, NUMERO, NUMCP, LIBEC, TXTVA, HT, TVA, TTC, MTDEBS, MTCRES) VALUES ('L" +
                  std::string(numero) + "', '" + numero + "', '" + lines[i] +
                  "', 'Ligne', 20, '100', '20', '120', '100', '100')");
    }
  }
  // Prints as an access screen asks; false when the action failed.
  bool imprimer(const std::string& name, const std::string& request) {
    return session().action([&] {
      host::AutomatePtr caller = host::Registre::instance().creer("MIRVAE-INTERFACE", nullptr);
      Chaine printName(name), sql(request);
      host::EvtParamRef e(2, &printName, &sql);
      caller->appelerProcedure("*", "MIRVAE", "INTERFACE", "IMPRESSION", &e, -1);
    });
  }
  const model::Impression& printed() { return model::Imprimante::courante().derniere(); }
  std::string pdfText(const char* options = "-layout") {
    return testing_support::runCommand("{ pdftotext " + std::string(options) + " '" + pdf_ + "' - 2>/dev/null; }").out;
  }

  std::string pdf_;
};

TEST_F(ImprTest, EachKindsFormNamesItsAccountAndTitlesItsLines) {
  const struct {
    int kind;
    const char* type;
    const char* numcp;
    const char* line;
    const char* title;
    const char* name;  // nullptr: the form has no name and address block
    const char* place;
  } kinds[] = {
      {1, "FC", "411002", "706300", "Facture client", "SCI Berthomieu", "24350 TOCANE-SAINT-APRE"},
      {2, "FF", "401001", "601000", "Facture fournisseur", "Scierie Maurel Frères", "24260 LE BUGUE"},
      {3, "NDF", "421002", "625100", "Note de frais", "Roques Émilie", "24430 MARSAC-SUR-L'ISLE"},
      {4, "BQ", "512100", "627000", "Opération de banque", "Banque compte courant", " "},
      {5, "CA", "530000", "606400", "Opération de caisse", "Caisse", " "},
      {6, "OD", "", "512200", "Opération diverse", nullptr, nullptr},
  };
  for (const auto& k : kinds) {
    SCOPED_TRACE(k.kind);
    std::string ident = "0000010" + std::to_string(k.kind);
    operation(ident, k.type, k.numcp, {k.line, k.line});
    std::string lineTitle = sql("SELECT LIBCP FROM COMPT WHERE NUMCP = '" + std::string(k.line) + "'");
    ASSERT_FALSE(lineTitle.empty());
    model::Imprimante::courante().versFichier(pdf_);
    ASSERT_TRUE(imprimer("fiche" + std::to_string(k.kind), model::requeteFiche(ident)));
    const auto& blocks = printed().blocks;
    ASSERT_EQ(blocks.size(), 3u);
    EXPECT_EQ(blocks[0].kind, "fiche");
    bool hasAddress = std::any_of(blocks[0].values.begin(), blocks[0].values.end(),
                                  [](const auto& v) { return v.first == "VNOM" || v.first == "VADRESSE"; });
    EXPECT_EQ(hasAddress, k.name != nullptr);
    if (k.name) {
      EXPECT_EQ(valueOf(blocks[0].values, "VNOM"), k.name);
      EXPECT_EQ(valueOf(blocks[0].values, "VCPVILLE"), k.place);
    }
    EXPECT_EQ(valueOf(blocks[1].values, "VLIBCP"), lineTitle);
    EXPECT_EQ(valueOf(blocks[2].values, "MIRVAL.NUMERO"), ident + "|000002");

    std::string text = pdfText();
    std::vector<std::string> wanted = {"Atelier Castagnède SARL", k.title, "P" + ident};
    if (k.name) wanted.push_back(k.name);
    wanted.insert(wanted.end(), {k.line, k.line, k.kind == 6 ? "Total débit" : "Total HT", "200,00"});
    EXPECT_TRUE(inOrder(text, wanted));
  }
}

TEST_F(ImprTest, TheCompanyPrintsWhatTheDossierHoldsOfItAndNothingElse) {
  operation("00000251", "FC", "411001", {"706300"});
  model::Imprimante::courante().versFichier(pdf_);
  ASSERT_TRUE(imprimer("fiche1", model::requeteFiche("00000251")));
  std::string bare = pdfText();
  EXPECT_EQ(bare.find("SIREN"), std::string::npos);
  base().exec(
      "INSERT INTO DOSSIER_INFO (CLE, VALEUR) VALUES ('company_address', 'Rue des Ébénistes'),"
      " ('company_town', 'PÉRIGUEUX'), ('company_siren', '123 456 789')");
  ASSERT_TRUE(imprimer("fiche1", model::requeteFiche("00000251")));
  EXPECT_TRUE(inOrder(pdfText(), {"Atelier Castagnède SARL", "Rue des Ébénistes", "PÉRIGUEUX", "SIREN 123 456 789",
                                  "Brasserie Lissandre"}));
  base().exec("INSERT INTO DOSSIER_INFO (CLE, VALEUR) VALUES ('company_postcode', '24000')");
  ASSERT_TRUE(imprimer("fiche1", model::requeteFiche("00000251")));
  EXPECT_NE(pdfText().find("24000 PÉRIGUEUX"), std::string::npos);
}

TEST_F(ImprTest, APrintLandsWithItsActionOnlyOneFileAPrint) {
  operation("00000261", "FC", "411001", {"706300"});
  const std::filesystem::path folder = pdf_ + "-impressions";
  model::Imprimante::courante().versDossier(folder.string());
  // Undone: the action failed after its print was made.
  EXPECT_FALSE(session().action([&] {
    imprimer("fiche1", model::requeteFiche("00000261"));
    throw host::HostError("refusé après l'impression");
  }));
  EXPECT_TRUE(std::filesystem::is_empty(folder));
  ASSERT_TRUE(imprimer("fiche1", model::requeteFiche("00000261")));
  ASSERT_TRUE(imprimer("fiche1", model::requeteFiche("00000261")));
  std::vector<std::string> files;
  for (const auto& entry : std::filesystem::directory_iterator(folder)) files.push_back(entry.path().filename());
  std::sort(files.begin(), files.end());
  EXPECT_EQ(files, (std::vector<std::string>{"fiche1-001.pdf", "fiche1-002.pdf"}));
  EXPECT_EQ(session().transcript().textes("impression"),
            (std::vector<std::string>{"fiche1 : " + (folder / "fiche1-001.pdf").string(),
                                      "fiche1 : " + (folder / "fiche1-002.pdf").string()}));
  std::filesystem::remove_all(folder);
}

TEST_F(ImprTest, PostcodeAndTownAreOneTextWithOneSpaceEvenWhenOneIsEmpty) {
  operation("00000201", "FC", "411001", {"706300"});
  const struct {
    const char *postcode, *town, *printed;
  } cases[] = {{"24000", "PÉRIGUEUX", "24000 PÉRIGUEUX"}, {"", "PÉRIGUEUX", " PÉRIGUEUX"}, {"24000", "", "24000 "},
               {"", "", " "}};
  for (const auto& c : cases) {
    base().exec(std::string("UPDATE COMPT SET CPOCP = '") + c.postcode + "', VILCP = '" + c.town +
                "' WHERE NUMCP = '411001'");
    ASSERT_TRUE(imprimer("fiche1", model::requeteFiche("00000201")));
    EXPECT_EQ(valueOf(printed().blocks[0].values, "VCPVILLE"), c.printed);
  }
}

TEST_F(ImprTest, AListHeadingComesFromTheCriteriaAsTheRequestWritesThem) {
  operation("00000301", "FC", "411001", {"706300"});
  const struct {
    const char* request;
    const char *from, *to, *account, *title;
  } cases[] = {
      {"Select * From \"MIRVAE\" Where TYPE = 'FC' And DTOPE >= '2024-03-01' And DTOPE <= '2024-03-31' And "
       "NUMCP = '411001'",
       "01/03/2024", "31/03/2024", "411001", "Brasserie Lissandre"},
      {"Select * From \"MIRVAE\" Where TYPE = 'FC' And DTOPE <= '2024-03-31'", "...", "31/03/2024", "", ""},
      {"Select * From \"MIRVAE\" Where TYPE = 'FC' And DTOPE >= '2024-03-01'", "01/03/2024", "31/12/9999", "", ""},
      // Written otherwise than the host writes it: no criterion is recognised.
      {"Select * From MIRVAE Where TYPE='FC' AND DTOPE>='2024-03-01' AND NUMCP='411001'", "...", "31/12/9999", "",
       ""},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.request);
    ASSERT_TRUE(imprimer("liste1", c.request));
    const model::Values& heading = printed().heading;
    EXPECT_EQ(valueOf(heading, "VREQUETE_SQL"), c.request);
    EXPECT_EQ(valueOf(heading, "VDATEMIN"), c.from);
    EXPECT_EQ(valueOf(heading, "VDATEMAX"), c.to);
    EXPECT_EQ(valueOf(heading, "VNUMCP"), c.account);
    EXPECT_EQ(valueOf(heading, "VLIBCP"), c.title);
    ASSERT_EQ(printed().blocks.size(), 1u);
    EXPECT_EQ(valueOf(printed().blocks[0].values, "VLIBCP1"), "Brasserie Lissandre");
  }
}

TEST_F(ImprTest, BankAndCashListsPrintADisbursementNegatedAndAnUnknownDirectionAsTheRowBefore) {
  for (const auto& [kind, type, account] : {std::tuple{4, "BQ", "512100"}, std::tuple{5, "CA", "530000"}}) {
    SCOPED_TRACE(kind);
    std::string k = std::to_string(kind);
    operation("0000040" + k, type, account, {"627000"}, "Frais", "D", "2024-03-01");
    operation("0000041" + k, type, account, {"706300", "706300"}, "Encaissement", "R", "2024-03-02");
    operation("0000042" + k, type, account, {"627000"}, "Sans sens", "", "2024-03-03");
    ASSERT_TRUE(imprimer("liste" + k, "Select * From \"MIRVAE\" Where TYPE = '" + std::string(type) +
                                          "' And TYPE_DR = 'D' Order By DTOPE"));
    EXPECT_EQ(valueOf(printed().heading, "VTYPE"), "D");
    const auto& rows = printed().blocks;
    ASSERT_EQ(rows.size(), 1u);
    ASSERT_TRUE(imprimer("liste" + k, "Select * From \"MIRVAE\" Where TYPE = '" + std::string(type) + "' Order By DTOPE"));
    const auto& all = printed().blocks;
    ASSERT_EQ(all.size(), 3u);
    const char* expected[][4] = {{"Dépense", "-100.00", "-20.00", "-120.00"},
                                 {"Recette", "200.00", "40.00", "240.00"},
                                 {"Recette", "200.00", "40.00", "240.00"}};
    for (std::size_t i = 0; i < all.size(); ++i) {
      EXPECT_EQ(valueOf(all[i].values, "VTYPE_DR"), expected[i][0]);
      EXPECT_EQ(valueOf(all[i].values, "VHT"), expected[i][1]);
      EXPECT_EQ(valueOf(all[i].values, "VTVA"), expected[i][2]);
      EXPECT_EQ(valueOf(all[i].values, "VTTC"), expected[i][3]);
    }
  }
}

TEST_F(ImprTest, ALabelPrintsVerbatimAndWrappedNeverCut) {
  const std::string labels[] = {
      "L'atelier \"Castagnède\" & fils",
      "x'); DROP TABLE MIRVAE; --",
      std::string(480, 'A') + "FINDULIBELLE",
  };
  int n = 0;
  for (const std::string& label : labels) operation("0000050" + std::to_string(++n), "FC", "411001", {"706300"}, label);
  model::Imprimante::courante().versFichier(pdf_);
  ASSERT_TRUE(imprimer("liste1", "Select * From \"MIRVAE\" Where TYPE = 'FC' Order By IDENT"));
  std::string text = pdfText("");
  std::string flat = withoutBlanks(text);
  for (const std::string& label : labels) EXPECT_NE(flat.find(withoutBlanks(label)), std::string::npos) << label;
  // The long label takes several lines of its column.
  std::size_t lines = 0;
  for (std::size_t at = 0; (at = text.find("AAAAAAAAAA", at)) != std::string::npos; at = text.find('\n', at)) ++lines;
  EXPECT_GT(lines, 3u);
  EXPECT_EQ(sql("SELECT count(*) FROM MIRVAE"), "3");
}

TEST_F(ImprTest, ALongListRepeatsItsHeadingsOnEveryPageAndRenders) {
  base().exec("BEGIN");
  for (int i = 0; i < 2000; ++i) {
    char ident[16];
    std::snprintf(ident, sizeof ident, "%08d", 10000 + i);
    operation(ident, "FC", "411001", {}, "Facture n° " + std::to_string(i));
  }
  base().exec("COMMIT");
  model::Imprimante::courante().versFichier(pdf_);
  ASSERT_TRUE(imprimer("liste1", "Select * From \"MIRVAE\" Where TYPE = 'FC' And DTOPE >= '2024-03-01'"));
  std::string text = pdfText();
  std::vector<std::string> pages;
  for (std::size_t start = 0, end; (end = text.find('\f', start)) != std::string::npos; start = end + 1)
    pages.push_back(text.substr(start, end - start));
  ASSERT_GT(pages.size(), 20u);
  for (std::size_t p = 0; p < pages.size(); ++p) {
    SCOPED_TRACE(p + 1);
    EXPECT_TRUE(inOrder(pages[p], {"Factures clients", "Date", "Pièce", "Compte", "Intitulé", "Libellé", "HT", "TVA",
                                   "TTC", "Page " + std::to_string(p + 1) + " / " + std::to_string(pages.size())}));
  }
  EXPECT_TRUE(inOrder(pages.front(), {"Du", "01/03/2024", "Au", "31/12/9999", "Facture n° 0", "Facture n° 1"}));
  EXPECT_TRUE(inOrder(text, {"Facture n° 1998", "Facture n° 1999", "Total", "0,00"}));
  // Every page renders.
  std::string images = testing_support::cheminTemporaire("mirvae-pages");
  testing_support::runCommand("pdftoppm -r 20 -png '" + pdf_ + "' '" + images + "'");
  std::size_t rendered = 0;
  for (const auto& entry : std::filesystem::directory_iterator(std::filesystem::path(images).parent_path()))
    if (entry.path().filename().string().rfind(std::filesystem::path(images).filename().string() + "-", 0) == 0) {
      ++rendered;
      EXPECT_GT(std::filesystem::file_size(entry.path()), 100u);
      std::filesystem::remove(entry.path());
    }
  EXPECT_EQ(rendered, pages.size());
}

}  // namespace
