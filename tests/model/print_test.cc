// Processes, print jobs and the interface's printing, on jobs of the tests' own.
#include "model/impetat.h"

#include <gtest/gtest.h>

#include "host/counter.h"
#include "host/error.h"
#include "host/registry.h"
#include "host/table.h"
#include "model/impression.h"
#include "model/interface.h"
#include "tests/support/fixture.h"

namespace {

using namespace host;

std::vector<std::string> journal;
bool quitAtDebut = false;

struct Traitement : model::Traitmnt {
  explicit Traitement(Evt* e) : Traitmnt(e) {
    addBranch("DEBUT", &Traitement::debut);
    addBranch("FAIRE", &Traitement::faire);
  }
  void debut(Evt* e) override {
    journal.push_back("DEBUT");
    if (quitAtDebut) sortir(e, 0);
  }
  void faire(Evt*) override { journal.push_back("FAIRE"); }
};

// A form: one record, its lines, the account's title per record.
struct Fiche : model::Edition_etat2 {
  Chaine VNOM{"VNOM", "", "", 0, this};
  Chaine VLIBCP{"VLIBCP", "", "", 0, this};
  Table MIRVAL{this, "", "MIRVAL", ""};
  Champ NUMCP{this, "NUMCP", table(false)};
  Champ L_NUMCP{"NUMCP", &MIRVAL};
  explicit Fiche(Evt* e) : Edition_etat2(e) {
    nomTable("MIRVAE", nullptr);
    addBranch("DEBUT", &Fiche::debut);
    addBranch("DEBUT_FICHE", &Fiche::debut_fiche);
    addBranch("LST_CORPS_IMPRIME", &Fiche::lst_corps_imprime);
  }
  void debut(Evt* e) override {
    journal.push_back("DEBUT " + table(false)->requete());
    Edition_etat2::debut(e);
  }
  void debut_fiche(Evt* e) override {
    Impetat::debut_fiche(e);
    VNOM = "Client " + NUMCP.chaine();
  }
  void lst_corps_imprime(Evt*) { VLIBCP = "Compte " + L_NUMCP.chaine(); }
};

// A list: one printed line per record.
struct Liste : model::Edition_etat2 {
  Chaine VLIBCP1{"VLIBCP1", "", "", 0, this};
  Champ NUMCP{this, "NUMCP", table(false)};
  explicit Liste(Evt* e) : Edition_etat2(e) {
    nomTable("MIRVAE", nullptr);
    addBranch("LST_CORPS_IMPRIME", &Liste::lst_corps_imprime);
  }
  void lst_corps_imprime(Evt*) { VLIBCP1 = NUMCP.chaine(); }
};

struct Interface : model::Interface2 {
  explicit Interface(Evt* e) : Interface2(e) { directoryAlias_ = "[ZEFDEV]\\COMPTA"; }
};

class PrintTest : public testing_support::DossierTest {
 protected:
  void SetUp() override {
    DossierTest::SetUp();
    testing_support::moduleDeTest<Traitement>("TEST-TRAITEMENT");
    testing_support::moduleDeTest<Fiche>("TEST-IMPR_FICHE1");
    testing_support::moduleDeTest<Liste>("TEST-IMPR_LISTE1");
    testing_support::moduleDeTest<Interface>("TEST-INTERFACE");
    journal.clear();
    quitAtDebut = false;
    model::Imprimante::courante().vider();
    base().exec(
        "INSERT INTO MIRVAE (IDENT, TYPE, NUMCP) VALUES ('D1', 'FC', '411001'), ('D2', 'FC', '411002'),"
        " ('F1', 'FF', '401001');"
        "INSERT INTO MIRVAL (IDENT, NUMERO, NUMCP) VALUES ('L1', 'D1|000001', '706100'),"
        " ('L2', 'D1|000002', '706200'), ('L3', 'D2|000001', '706300')");
  }
  // Asks the interface to print, as an access screen does; false when the action failed.
  bool imprimer(const std::string& name, const std::string& request) {
    auto caller = AutomatePtr(const_cast<Automate*>(fabriquer<Traitement>(nullptr)));
    return session().action([&] {
      Chaine printName(name), sql(request);
      EvtParamRef e(2, &printName, &sql);
      caller->appelerProcedure("*", "TEST", "INTERFACE", "IMPRESSION", &e, -1);
    });
  }
};

TEST_F(PrintTest, AProcessRunsDebutThenFaireUnlessItLeft) {
  session().action([&] { session().executer(Registre::instance().creer("TEST-TRAITEMENT", nullptr)); });
  quitAtDebut = true;
  session().action([&] { session().executer(Registre::instance().creer("TEST-TRAITEMENT", nullptr)); });
  EXPECT_EQ(journal, (std::vector<std::string>{"DEBUT", "FAIRE", "DEBUT"}));
  EXPECT_EQ(session().transcript().textes("ferme").size(), 2u);
}

TEST_F(PrintTest, AFormPrintsItsRecordAndTheRecordsLines) {
  std::string request = "Select * From TABLE Where IDENT = 'D1'";
  ASSERT_TRUE(imprimer("fiche1", request));
  EXPECT_EQ(journal, std::vector<std::string>{"DEBUT " + request});
  const model::Impression& printed = model::Imprimante::courante().derniere();
  EXPECT_EQ(printed.module, "TEST-IMPR_FICHE1");
  EXPECT_EQ(printed.lignes, (std::vector<std::string>{
                                "fiche D1 | VNOM=Client 411001 | VLIBCP=",
                                "ligne D1|000001 | VNOM=Client 411001 | VLIBCP=Compte 706100",
                                "ligne D1|000002 | VNOM=Client 411001 | VLIBCP=Compte 706200",
                            }));
}

TEST_F(PrintTest, AFormRequestKeepsAQuoteInsideItsIdentifier) {
  base().exec("INSERT INTO MIRVAE (IDENT, TYPE, NUMCP) VALUES ('D''3', 'FC', '411003')");
  ASSERT_TRUE(imprimer("fiche1", model::requeteFiche("D'3")));
  EXPECT_EQ(model::Imprimante::courante().derniere().lignes,
            std::vector<std::string>{"fiche D'3 | VNOM=Client 411003 | VLIBCP="});
}

TEST_F(PrintTest, AListPrintsOneLinePerRowOfTheRequest) {
  ASSERT_TRUE(imprimer("liste1", "Select * From \"MIRVAE\" Where TYPE = 'FC' Order By IDENT Desc"));
  EXPECT_EQ(model::Imprimante::courante().derniere().lignes,
            (std::vector<std::string>{"ligne D2 | VLIBCP1=411002", "ligne D1 | VLIBCP1=411001"}));
}

TEST_F(PrintTest, BadPrintRequestsFailTheActionAndSayWhy) {
  struct Cas {
    const char* name;
    const char* request;
    const char* error;
  };
  for (const Cas& cas : {
           Cas{"liste2", "Select * From TABLE", "le module d'impression « TEST-IMPR_LISTE2 » n'est pas enregistré"},
           Cas{"etat1", "Select * From TABLE", "nom d'impression « etat1 » inconnu"},
           Cas{"fiche1", "Delete From TABLE", "une requête d'impression ne fait que lire : Delete From TABLE"},
           Cas{"fiche1", "Select * From TABLE; Delete From TABLE",
               "une requête d'impression est une seule instruction : Select * From TABLE; Delete From TABLE"},
       }) {
    EXPECT_FALSE(imprimer(cas.name, cas.request)) << cas.name;
    EXPECT_EQ(session().transcript().textes("erreur").back(), std::string("IMPRESSION : ") + cas.error);
  }
  EXPECT_EQ(sql("SELECT count(*) FROM MIRVAE"), "3");
  EXPECT_TRUE(model::Imprimante::courante().impressions().empty());
}

TEST_F(PrintTest, IdentifiersComeFromTheCountersInTurn) {
  session().action([&] {
    EXPECT_EQ(host::nextIdentifier(base(), "MIRVAE", 8), "00000001");
    EXPECT_EQ(host::nextIdentifier(base(), "MIRVAE", 8), "00000002");
    // A row the counter did not hand out (a dossier mended by hand): never handed out again.
    base().exec("INSERT INTO MIRVAE (IDENT, TYPE, NUMCP) VALUES ('00000041', 'FC', '411001')");
    EXPECT_EQ(host::nextIdentifier(base(), "MIRVAE", 8), "00000042");
    EXPECT_EQ(host::nextIdentifier(base(), "NOUVEAU", 3), "001");
    base().exec("UPDATE NDOC SET DERNIER = 999 WHERE NOM = 'NOUVEAU'");
    EXPECT_THROW(host::nextIdentifier(base(), "NOUVEAU", 3), HostError);
  });
  // Outside a user action the number could not be given back.
  EXPECT_THROW(host::nextIdentifier(base(), "MIRVAE", 8), HostError);
}

TEST_F(PrintTest, BindingsOfOneMemoryImageShareItsRows) {
  auto owner = AutomatePtr(const_cast<Automate*>(fabriquer<Traitement>(nullptr)));
  auto other = AutomatePtr(const_cast<Automate*>(fabriquer<Traitement>(nullptr)));
  auto a = std::make_unique<Table>(owner.get(), "", "MEM:MIRVAL", "MEM_A");
  Table b(owner.get(), "", "MEM:MIRVAL", "MEM_B");
  Table c(other.get(), "", "MEM:MIRVAL", "MEM_C");
  Champ numero("NUMERO", a.get());
  a->raz();
  numero = "X|000001";
  a->ecrit();
  EXPECT_EQ(b.nombre(), 1);
  EXPECT_EQ(c.nombre(), 0);
  a.reset();
  EXPECT_EQ(b.nombre(), 1);
}

}  // namespace
