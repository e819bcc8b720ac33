#include "host/table.h"

#include <gtest/gtest.h>
#include <sqlite3.h>

#include "host/error.h"
#include "model/traitmnt.h"
#include "tests/support/fixture.h"

namespace {

using namespace host;

// A bare automaton to own the bindings of a test.
struct Porteur : model::Traitmnt {
  explicit Porteur(Evt* e) : Traitmnt(e) {}
};

class TableTest : public testing_support::DossierTest {
 protected:
  void SetUp() override {
    DossierTest::SetUp();
    owner_ = std::make_unique<Porteur>(nullptr);
  }
  void TearDown() override {
    owner_.reset();
    DossierTest::TearDown();
  }
  std::unique_ptr<Porteur> owner_;
};

TEST_F(TableTest, ReadsByKeyAndConvertsKinds) {
  Table param(owner_.get(), "", "PARAM", "");
  Champ pnume("PNUME", &param), pddex("PDDEX", &param), pre18("PRE18", &param);
  ASSERT_EQ(param.lit(3, pnume, '=', Valeur::entier(1)), 0);
  EXPECT_EQ(pddex.chaine(), "01/01/2024");
  EXPECT_EQ(pre18, "O");
  EXPECT_EQ(pddex.genre(), Genre::Date);
  EXPECT_NE(param.lit(3, pnume, '=', Valeur::entier(2)), 0);
}

TEST_F(TableTest, EachFilterOperator) {
  Table compt(owner_.get(), "", "COMPT", "COMPT1");
  Champ numcp("NUMCP", &compt), natuc("NATUC", &compt);
  auto count = [&](char op, const char* value) {
    compt.initRequete();
    compt.ajouteFiltre(numcp, op, value);
    compt.activeRequete();
    int n = 0;
    for (int rc = compt.suivant(3); rc == 0; rc = compt.suivant(1)) ++n;
    return n;
  };
  long long total = std::stoll(sql("SELECT count(*) FROM COMPT"));
  long long clients = std::stoll(sql("SELECT count(*) FROM COMPT WHERE NUMCP LIKE '411%'"));
  EXPECT_EQ(count('/', "411"), clients);
  EXPECT_EQ(count('=', "512100"), 1);
  EXPECT_EQ(count('#', "512100"), total - 1);
  EXPECT_EQ(count('+', "7"), std::stoll(sql("SELECT count(*) FROM COMPT WHERE NUMCP >= '7'")));
  EXPECT_EQ(count('-', "2"), 0);
  compt.initRequete();
  compt.ajouteFiltre(natuc, '?', "C");
  EXPECT_EQ(compt.nombre(), std::stoll(sql("SELECT count(*) FROM COMPT WHERE instr(NATUC, 'C') > 0")));
}

TEST_F(TableTest, AliasesMoveIndependently) {
  Table a(owner_.get(), "", "COMPT", "COMPT1"), b(owner_.get(), "", "COMPT", "COMPT2");
  Champ na("NUMCP", &a), nb("NUMCP", &b);
  a.initRequete();
  a.activeRequete();
  b.initRequete();
  b.activeRequete();
  ASSERT_EQ(a.suivant(3), 0);
  ASSERT_EQ(b.suivant(3), 0);
  ASSERT_EQ(b.suivant(1), 0);
  std::string second = nb.chaine();
  EXPECT_LT(na.chaine(), second);
  ASSERT_EQ(a.suivant(1), 0);
  EXPECT_EQ(na.chaine(), second);
}

TEST_F(TableTest, TextsAreStoredVerbatim) {
  Table mirvae(owner_.get(), "", "MIRVAE", "");
  Champ ident("IDENT", &mirvae), inpie("INPIE", &mirvae);
  for (const char* text : {"O'Brien", "'; DROP TABLE MIRVAE; --", "Facture client n° [PIECE]"}) {
    std::string key = "X" + std::to_string(std::hash<std::string>{}(text) % 100000);
    mirvae.raz();
    ident = key;
    inpie = text;
    mirvae.ecrit();
    mirvae.raz();
    ASSERT_EQ(mirvae.lit(3, ident, '=', key), 0);
    EXPECT_EQ(inpie.chaine(), text);
  }
  EXPECT_EQ(sql("SELECT count(*) FROM MIRVAE"), "3");
}

TEST_F(TableTest, RequestTextRunsInSqlite) {
  Table mirvae(owner_.get(), "", "MIRVAE", "");
  Champ type("TYPE", &mirvae), dtope("DTOPE", &mirvae), inpie("INPIE", &mirvae);
  mirvae.initRequete();
  mirvae.ajouteFiltre(type, '=', "FC");
  mirvae.ajouteFiltre(dtope, '+', Valeur::date(*lireJour("01/02/2024")));
  mirvae.ajouteFiltre(inpie, '/', "l'été");
  mirvae.choisitIndex("INDX1");
  std::string text = mirvae.requete();
  EXPECT_NE(text.find("TYPE = 'FC'"), std::string::npos) << text;
  EXPECT_NE(text.find("DTOPE >= '2024-02-01'"), std::string::npos) << text;
  EXPECT_NO_THROW(base().exec(text)) << text;
}

// A request over an index, with an equality and a range on its first columns, as the
// lists ask: the rows come once each in index order (ties broken by the next columns),
// and the row after the current one is sought, not walked to from the request's first
// row: the last step costs what the first does, however far the request has gone.
TEST_F(TableTest, NextRowOfARequestFollowsItsIndexOrder) {
  base().exec(R"(
    WITH RECURSIVE n(i) AS (SELECT 0 UNION ALL SELECT i + 1 FROM n WHERE i + 1 < 900)
    INSERT INTO MIRVAE (IDENT, TYPE, DTOPE, NPIEC)
    SELECT printf('%08d', 900 - i), CASE i % 3 WHEN 0 THEN 'FF' ELSE 'FC' END,
           date('2024-01-01', printf('+%d days', i / 10)), printf('VT%02d', i % 2) FROM n)");
  Table mirvae(owner_.get(), "", "MIRVAE", "");
  Champ type("TYPE", &mirvae), dtope("DTOPE", &mirvae), npiec("NPIEC", &mirvae), ident("IDENT", &mirvae);
  mirvae.initRequete();
  mirvae.ajouteFiltre(type, '=', "FC");
  mirvae.ajouteFiltre(dtope, '+', Valeur::date(*lireJour("01/02/2024")));
  mirvae.ajouteFiltre(dtope, '-', Valeur::date(*lireJour("29/02/2024")));
  mirvae.choisitIndex("INDX1");
  mirvae.activeRequete();

  std::vector<std::string> seen;
  for (int rc = mirvae.suivant(3); rc == 0; rc = mirvae.suivant(1))
    seen.push_back(dtope.chaine() + " " + npiec.chaine() + " " + ident.chaine());

  std::vector<std::string> expected;
  host::Statement& s = base().prepare(
      "SELECT DTOPE, NPIEC, IDENT FROM MIRVAE WHERE TYPE = 'FC' AND DTOPE BETWEEN '2024-02-01' AND '2024-02-29' "
      "ORDER BY DTOPE, NPIEC, IDENT");
  while (s.step())
    expected.push_back(s.text(0).substr(8, 2) + "/" + s.text(0).substr(5, 2) + "/" + s.text(0).substr(0, 4) + " " +
                       s.text(1) + " " + s.text(2));
  s.reset();
  ASSERT_GT(expected.size(), 150u);
  EXPECT_EQ(seen, expected);
}

TEST_F(TableTest, BadValuesAreRefusedWithTheirName) {
  Table mirvae(owner_.get(), "", "MIRVAE", "");
  Champ ht("HT", &mirvae), dtope("DTOPE", &mirvae);
  try {
    ht = "douze";
    FAIL();
  } catch (const HostError& e) {
    EXPECT_NE(std::string(e.what()).find("HT"), std::string::npos) << e.what();
  }
  EXPECT_THROW(dtope = "31/02/2024", HostError);
  EXPECT_THROW(Champ("NOPE", &mirvae).chaine(), HostError);
}

}  // namespace

namespace {

// The copy behind a memory image is not dropped with its automaton but handed, empty,
// to the next automaton that needs the same image: no table is made, so the schema
// stays as it was and the cached statements need no new preparation. A copy given
// back inside an action that fails gets its rows back with the rollback, and is
// emptied again.
TEST_F(TableTest, MemoryImageOfAGoneAutomatonIsHandedEmptyToTheNextOne) {
  auto schemaVersion = [&] { return sql("PRAGMA temp.schema_version"); };
  auto fill = [](Table& image) {
    Champ numero("NUMERO", &image);
    for (const char* n : {"A|000001", "A|000002"}) {
      image.raz();
      numero = n;
      image.ecrit();
    }
  };
  for (bool failing : {false, true}) {
    SCOPED_TRACE(failing ? "given back in a failed action" : "given back");
    auto first = std::make_unique<Porteur>(nullptr);
    auto image = std::make_unique<Table>(first.get(), "", "MEM:MIRVAL", "MEM_MIRVAL");
    fill(*image);
    session().action([&] {
      image.reset();
      first.reset();
      if (failing) throw HostError("échec voulu");
    });
    std::string version = schemaVersion();
    Porteur second(nullptr);
    Table next(&second, "", "MEM:MIRVAL", "MEM_MIRVAL");
    next.initRequete();
    EXPECT_EQ(next.nombre(), 0);
    EXPECT_EQ(schemaVersion(), version);
    fill(next);
    EXPECT_EQ(next.nombre(), 2);
  }
}

TEST_F(TableTest, MemoryImageOutlivesAFailedActionThatMadeIt) {
  Table image(owner_.get(), "", "MEM:MIRVAL", "MEM_MIRVAL");
  Champ numero("NUMERO", &image);
  bool ok = session().action([&] {
    image.raz();  // the image is made here, inside the unit that fails
    throw host::HostError("échec voulu");
  });
  EXPECT_FALSE(ok);
  image.raz();
  numero = "A|000001";
  EXPECT_NO_THROW(image.ecrit());
  image.initRequete();
  EXPECT_EQ(image.nombre(), 1);
}

}  // namespace
