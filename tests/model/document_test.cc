// The entry document's cycle (modes, lines, save, deletion), driven through the
// user's hands on a small document of the tests' own over MIRVAE and MIRVAL.
#include "model/gestion_document.h"

#include <gtest/gtest.h>

#include "host/counter.h"
#include "host/error.h"
#include "host/registry.h"
#include "host/table.h"
#include "model/mains.h"
#include "tests/support/fixture.h"

namespace {

using namespace host;

std::vector<std::string> journal;
// What the handlers of the test document do, set by each test.
struct Consignes {
  bool refuserValidation = false;
  bool refuserSuppression = false;
  bool visuSurModification = false;
  std::string casserDonneesSur;  // NUMERO whose VALIDATION_DONNEES raises a host error
  int reponseCreation = 0;       // REPONSE given to "VA_CREAT"
} consignes;

struct DocumentTest : model::Gestion_document2 {
  Chaine PIDENT{"PIDENT", "", "", 0, this};
  Chaine PMODE{"PMODE", "", "", 0, this};
  Monnaie V_HT{"V_HT", "", "", 0, this};
  Table MIRVAL{this, "", "MIRVAL", ""};
  Table MEM_MIRVAL{this, "", "MEM:MIRVAL", "MEM_MIRVAL"};
  Champ TYPE{this, "TYPE", table(false)};
  Champ L_IDENT{"IDENT", &MIRVAL};
  Champ L_NUMERO{"NUMERO", &MIRVAL};
  Champ L_NUMCP{"NUMCP", &MIRVAL};
  Champ L_HT{"HT", &MIRVAL};
  Champ M_NUMCP{"NUMCP", &MEM_MIRVAL};

  explicit DocumentTest(Evt* e) : Gestion_document2(e) {
    if (e && e->nbParams() > 0) {
      e->param(0, PIDENT, 0);
      e->param(1, PMODE, 0);
    }
    nomBase("CP");
    nomEcran("+TEST");
    modeSaisie(PMODE);
    nomTable("MIRVAE", nullptr);
    configureDocument("P1,LST", "LST", "MIRVAL");
    for (const char* name : {"INIT", "AVANT_DEBUT", "DEBUT_FICHE", "DEBUT_VISUALISATION", "DEBUT_MODIFICATION",
                             "APRES_DEBUT_CREATION", "CTRL_DEBUT_LIGNE", "DEBUT_CREATION_LIGNE",
                             "APRES_VALIDATION_LIGNE", "APRES_SUPPRESSION_LIGNE", "APRES_VALIDATION", "FIN_CREATION",
                             "APRES_ABANDON", "P1_SORTIE", "LST_ENTREE"})
      addBranch(name, &DocumentTest::trace);
    addBranch("SELECTION_TRI", &DocumentTest::selection_tri);
    addBranch("DEBUT_CREATION", &DocumentTest::debut_creation);
    addBranch("MODIFICATION", &DocumentTest::modification);
    addBranch("SELECTION", &DocumentTest::selection);
    addBranch("LST_MIRVAL.NUMCP", &DocumentTest::lst_mirval_numcp);
    addBranch("LST_V_HT", &DocumentTest::lst_v_ht);
    addBranch("VALIDATION_LIGNE", &DocumentTest::validation_ligne);
    addBranch("VALIDATION", &DocumentTest::validation);
    addBranch("AVANT_SUPPRESSION", &DocumentTest::avant_suppression);
    addBranch("DIALOGUE", &DocumentTest::dialogue);
    addBranch("EXTRACTION_DONNEES", &DocumentTest::donnees);
    addBranch("VALIDATION_DONNEES", &DocumentTest::donnees);
    addBranch("SUPPRESSION_DONNEES", &DocumentTest::donnees);
    addBranch("IMPORTER", &DocumentTest::importer);
    addBranch("SOLDER", &DocumentTest::solder);
  }

  void trace(Evt* e) { journal.push_back(e->nom()); }
  void selection_tri(Evt* e) override {
    journal.push_back(e->nom());
    if (TYPE != "FC") rejeter(e);
  }
  void debut_creation(Evt* e) override {
    Gestion_document2::debut_creation(e);
    journal.push_back(e->nom());
    TYPE = "FC";
  }
  void modification(Evt* e) override {
    journal.push_back(e->nom());
    if (consignes.visuSurModification)
      ecran()->toVisu();
    else
      Gestion_document2::modification(e);
  }
  void selection(Evt*) override { V_HT = L_HT; }
  void lst_mirval_numcp(Evt* e) {
    if (L_NUMCP.chaine().rfind("7", 0) != 0) {
      controler("LST_MIRVAL.NUMCP");
      rejeter(e);
    }
  }
  void lst_v_ht(Evt*) { L_HT = V_HT; }
  void validation_ligne(Evt* e) override {
    journal.push_back(e->nom());
    if (L_HT.estVide()) {
      controler("LST_V_HT");
      rejeter(e);
      return;
    }
    if (L_IDENT.estVide()) L_IDENT = host::nextIdentifier(session().base(), "MIRVAL", 8);
    Gestion_document2::validation_ligne(e);
  }
  void validation(Evt* e) override {
    journal.push_back(e->nom());
    if (consignes.refuserValidation) {
      controler("");
      rejeter(e);
      return;
    }
    Gestion_document2::validation(e);
  }
  void avant_suppression(Evt* e) override {
    journal.push_back(e->nom());
    if (!consignes.refuserSuppression) Gestion_document2::avant_suppression(e);
  }
  void dialogue(Evt* e) override {
    journal.push_back(e->nom() + " " + e->parametre(0).chaine());
    e->parametre(1) = consignes.reponseCreation;
  }
  void donnees(Evt* e) {
    journal.push_back(e->nom() + " " + L_NUMERO.chaine() + " " + L_NUMCP.chaine());
    if (e->nom() == "VALIDATION_DONNEES" && L_NUMERO == consignes.casserDonneesSur)
      throw HostError("panne voulue");
  }
  // A button that changes the current line, as a balance button does.
  void solder(Evt* e) {
    EvtParamRef list(1, "LST");
    appelerProcedure("", "", "", "CTRL_DEBUT_MODIF_LISTE", &list, 0);
    if (refuse()) return;
    L_HT = 99;
    ecran()->fonction(20, "LST");
  }
  // Fills the lines as an entry model would: three lines added, the middle one
  // removed from the image, the rest numbered again.
  void importer(Evt*) {
    for (const char* account : {"706100", "706200", "706300"}) {
      MIRVAL.raz();
      L_NUMCP = account;
      L_HT = 10;
      appelerProcedure("", "", "", "AJOUTER_LIGNE", nullptr, 0);
    }
    Champ numcp("NUMCP", &MEM_MIRVAL);
    MEM_MIRVAL.lit(3, numcp, '=', "706200");
    MEM_MIRVAL.supprime();
    appelerProcedure("", "", "", "RENUMEROTE_LIGNES", nullptr, 0);
  }
};

class DocumentCycleTest : public testing_support::DossierTest {
 protected:
  void SetUp() override {
    DossierTest::SetUp();
    testing_support::moduleDeTest<DocumentTest>("TEST-MODELE_DOCUMENT");
    journal.clear();
    consignes = Consignes();
  }
  // Opens the document with an identifier and a mode string, as an access screen does.
  bool ouvrirDocument(const std::string& ident, const std::string& modes) {
    Chaine id(ident), mode(modes);
    launches_.push_back(std::make_unique<EvtParamVal>(2, &id, &mode));
    return session().action(
        [&] { session().ouvrir(Registre::instance().creer("TEST-MODELE_DOCUMENT", launches_.back().get())); });
  }
  // Launch events outlive their screens, which the session closes first.
  std::vector<std::unique_ptr<Evt>> launches_;
  void saisirLigne(const std::string& account, const std::string& amount) {
    ASSERT_TRUE(model::nouvelleLigne(session()));
    ASSERT_TRUE(model::saisir(session(), "LST_MIRVAL.NUMCP", account));
    ASSERT_TRUE(model::saisir(session(), "LST_V_HT", amount));
    ASSERT_TRUE(model::validerLigne(session()));
  }
  model::Sdocum& document() { return dynamic_cast<model::Sdocum&>(model::ecranDevant(session())); }
  std::string lignesDe(const std::string& ident) {
    return sql("SELECT group_concat(NUMERO || ' ' || NUMCP || ' ' || printf('%.2f', HT), ', ') FROM (SELECT * FROM MIRVAL WHERE "
               "NUMERO LIKE '" + ident + "|%' ORDER BY NUMERO)");
  }
  void documentEnregistre() {
    base().exec(
        "INSERT INTO MIRVAE (IDENT, TYPE, NUMCP) VALUES ('D1', 'FC', '411001'), ('F1', 'FF', '401001');"
        "INSERT INTO MIRVAL (IDENT, NUMERO, NUMCP, HT) VALUES ('L1', 'D1|000001', '706100', '10.00'),"
        " ('L2', 'D1|000002', '706200', '20.00'), ('L3', 'D10|000001', '706900', '1.00')");
  }
};

TEST_F(DocumentCycleTest, CreationSavesHeaderAndLinesInOrderWithTheirDataSteps) {
  ASSERT_TRUE(model::ouvrir(session(), "TEST-MODELE_DOCUMENT"));
  EXPECT_EQ(journal, (std::vector<std::string>{"INIT", "AVANT_DEBUT", "DEBUT_CREATION", "DEBUT_FICHE",
                                               "APRES_DEBUT_CREATION"}));
  EXPECT_EQ(document().modeCourant(), "C");
  ASSERT_TRUE(model::saisir(session(), "MIRVAE.NUMCP", "411001"));
  journal.clear();
  saisirLigne("706100", "100.00");
  saisirLigne("706200", "19.60");
  EXPECT_EQ(journal, (std::vector<std::string>{"P1_SORTIE", "LST_ENTREE", "CTRL_DEBUT_LIGNE", "DEBUT_CREATION_LIGNE",
                                               "VALIDATION_LIGNE", "APRES_VALIDATION_LIGNE", "CTRL_DEBUT_LIGNE",
                                               "DEBUT_CREATION_LIGNE", "VALIDATION_LIGNE", "APRES_VALIDATION_LIGNE"}));
  auto rows = model::lignes(session());
  ASSERT_EQ(rows.size(), 2u);
  EXPECT_EQ(rows[1].at("MIRVAL.NUMCP"), "706200");
  EXPECT_EQ(rows[1].at("V_HT"), "19.60");
  journal.clear();
  ASSERT_TRUE(model::appuyer(session(), "VALID_DOC"));
  EXPECT_EQ(journal, (std::vector<std::string>{"VALIDATION", "VALIDATION_DONNEES 00000001|000001 706100",
                                               "VALIDATION_DONNEES 00000001|000002 706200", "APRES_VALIDATION",
                                               "FIN_CREATION", "DIALOGUE VA_CREAT", "DEBUT_VISUALISATION"}));
  EXPECT_EQ(sql("SELECT IDENT || ' ' || TYPE || ' ' || NUMCP FROM MIRVAE"), "00000001 FC 411001");
  EXPECT_EQ(lignesDe("00000001"), "00000001|000001 706100 100.00, 00000001|000002 706200 19.60");
  EXPECT_EQ(sql("SELECT group_concat(IDENT) FROM MIRVAL"), "00000001,00000002");
  EXPECT_EQ(document().modeCourant(), "V");
}

TEST_F(DocumentCycleTest, GoingOnCreatingStartsAFreshDocument) {
  consignes.reponseCreation = 1;
  model::ouvrir(session(), "TEST-MODELE_DOCUMENT");
  saisirLigne("706100", "5");
  journal.clear();
  ASSERT_TRUE(model::appuyer(session(), "VALID_DOC"));
  EXPECT_EQ(journal.back(), "APRES_DEBUT_CREATION");
  EXPECT_EQ(document().modeCourant(), "C");
  EXPECT_TRUE(model::lignes(session()).empty());
  EXPECT_EQ(model::valeur(session(), "MIRVAE.IDENT"), "");
  EXPECT_EQ(sql("SELECT count(*) FROM MIRVAE"), "1");
}

TEST_F(DocumentCycleTest, RefusedValidationSavesNothingAndKeepsTheEntry) {
  consignes.refuserValidation = true;
  model::ouvrir(session(), "TEST-MODELE_DOCUMENT");
  saisirLigne("706100", "5");
  EXPECT_FALSE(model::appuyer(session(), "VALID_DOC"));
  EXPECT_EQ(sql("SELECT count(*) FROM MIRVAE") + sql("SELECT count(*) FROM MIRVAL"), "00");
  EXPECT_EQ(document().modeCourant(), "C");
  EXPECT_EQ(model::lignes(session()).size(), 1u);
  EXPECT_EQ(session().transcript().textes("refus").back(), "VALID_DOC");
}

TEST_F(DocumentCycleTest, AFailedSaveLeavesNoRowAndGivesItsNumbersBack) {
  consignes.casserDonneesSur = "00000001|000002";
  model::ouvrir(session(), "TEST-MODELE_DOCUMENT");
  saisirLigne("706100", "5");
  saisirLigne("706200", "6");
  EXPECT_FALSE(model::appuyer(session(), "VALID_DOC"));
  EXPECT_EQ(sql("SELECT count(*) FROM MIRVAE") + sql("SELECT count(*) FROM MIRVAL"), "00");
  EXPECT_EQ(sql("SELECT DERNIER FROM NDOC WHERE NOM = 'MIRVAE'"), "0");
  EXPECT_EQ(session().transcript().textes("erreur").back(), "VALIDATION_DONNEES : panne voulue");
  consignes.casserDonneesSur.clear();
  ASSERT_TRUE(model::appuyer(session(), "VALID_DOC"));
  EXPECT_EQ(sql("SELECT IDENT FROM MIRVAE"), "00000001");
  EXPECT_EQ(lignesDe("00000001"), "00000001|000001 706100 5.00, 00000001|000002 706200 6.00");
}

TEST_F(DocumentCycleTest, RefusedLinesAndColumnsKeepWhatWasThere) {
  model::ouvrir(session(), "TEST-MODELE_DOCUMENT");
  ASSERT_TRUE(model::nouvelleLigne(session()));
  ASSERT_TRUE(model::saisir(session(), "LST_MIRVAL.NUMCP", "706100"));
  EXPECT_FALSE(model::saisir(session(), "LST_MIRVAL.NUMCP", "411001"));
  EXPECT_EQ(model::valeur(session(), "LST_MIRVAL.NUMCP"), "706100");
  EXPECT_FALSE(model::validerLigne(session()));
  EXPECT_TRUE(document().lineInEntry());
  EXPECT_TRUE(model::lignes(session()).empty());
  EXPECT_EQ(session().transcript().textes("refus"),
            (std::vector<std::string>{"LST_MIRVAL.NUMCP = 411001", "valider la ligne (LST_V_HT)"}));
  ASSERT_TRUE(model::saisir(session(), "LST_V_HT", "12.5"));
  ASSERT_TRUE(model::validerLigne(session()));
  EXPECT_EQ(model::lignes(session()).at(0).at("HT"), "12.50");
  EXPECT_THROW(model::saisir(session(), "LST_MIRVAL.INCONNU", "1"), HostError);
}

TEST_F(DocumentCycleTest, OpeningExtractsEachLineAndSavingReplacesTheOldOnes) {
  documentEnregistre();
  ASSERT_TRUE(ouvrirDocument("D1", "VMCAm"));
  EXPECT_EQ(journal, (std::vector<std::string>{"INIT", "AVANT_DEBUT", "SELECTION_TRI",
                                               "EXTRACTION_DONNEES D1|000001 706100",
                                               "EXTRACTION_DONNEES D1|000002 706200", "DEBUT_FICHE", "MODIFICATION",
                                               "DEBUT_MODIFICATION"}));
  ASSERT_TRUE(model::allerLigne(session(), 1));
  EXPECT_EQ(model::valeur(session(), "LST_V_HT"), "10.00");
  ASSERT_TRUE(model::supprimerLigne(session()));
  saisirLigne("706300", "30");
  journal.clear();
  ASSERT_TRUE(model::appuyer(session(), "VALID_DOC"));
  EXPECT_EQ(journal, (std::vector<std::string>{"VALIDATION", "SUPPRESSION_DONNEES D1|000001 706100",
                                               "SUPPRESSION_DONNEES D1|000002 706200",
                                               "VALIDATION_DONNEES D1|000001 706200",
                                               "VALIDATION_DONNEES D1|000002 706300", "APRES_VALIDATION"}));
  EXPECT_EQ(lignesDe("D1"), "D1|000001 706200 20.00, D1|000002 706300 30.00");
  EXPECT_EQ(lignesDe("D10"), "D10|000001 706900 1.00");
  EXPECT_EQ(document().modeCourant(), "M");
}

TEST_F(DocumentCycleTest, AnotherKindOrAMissingDocumentIsNeverShown) {
  documentEnregistre();
  ouvrirDocument("F1", "VMCAv");
  EXPECT_EQ(session().ecranCourant(), nullptr);
  ouvrirDocument("ZZ", "VMCAv");
  EXPECT_EQ(session().ecranCourant(), nullptr);
  EXPECT_EQ(session().transcript().textes("message"),
            (std::vector<std::string>{"La fiche « F1 » n'est pas accessible depuis cet écran.",
                                      "La fiche « ZZ » est introuvable."}));
}

TEST_F(DocumentCycleTest, VisualisationRefusesEveryChangeAndAHandlerMayAskForIt) {
  documentEnregistre();
  ASSERT_TRUE(ouvrirDocument("D1", "Vv"));
  EXPECT_EQ(document().modeCourant(), "V");
  EXPECT_FALSE(model::saisir(session(), "MIRVAE.NUMCP", "411002"));
  EXPECT_FALSE(model::nouvelleLigne(session()));
  ASSERT_TRUE(model::allerLigne(session(), 2));
  EXPECT_FALSE(model::saisir(session(), "LST_V_HT", "1"));
  EXPECT_FALSE(model::appuyer(session(), "MODIFICATION"));
  EXPECT_FALSE(model::appuyer(session(), "SUPPRESSION"));
  EXPECT_FALSE(model::appuyer(session(), "VALID_DOC"));
  EXPECT_EQ(sql("SELECT NUMCP FROM MIRVAE WHERE IDENT = 'D1'"), "411001");
  model::fermer(session());

  consignes.visuSurModification = true;
  ASSERT_TRUE(ouvrirDocument("D1", "VMCAm"));
  EXPECT_EQ(document().modeCourant(), "V");
  EXPECT_EQ(journal.back(), "DEBUT_VISUALISATION");
  consignes.visuSurModification = false;
  ASSERT_TRUE(model::appuyer(session(), "MODIFICATION"));
  EXPECT_EQ(document().modeCourant(), "M");
}

TEST_F(DocumentCycleTest, DeletionNeedsItsStepAndTakesHeaderAndLines) {
  documentEnregistre();
  consignes.refuserSuppression = true;
  ouvrirDocument("D1", "VMCAv");
  EXPECT_FALSE(model::appuyer(session(), "SUPPRESSION"));
  EXPECT_EQ(sql("SELECT count(*) FROM MIRVAL WHERE NUMERO LIKE 'D1|%'"), "2");
  consignes.refuserSuppression = false;
  journal.clear();
  ASSERT_TRUE(model::appuyer(session(), "SUPPRESSION"));
  EXPECT_EQ(journal, (std::vector<std::string>{"AVANT_SUPPRESSION", "SUPPRESSION_DONNEES D1|000001 706100",
                                               "SUPPRESSION_DONNEES D1|000002 706200"}));
  EXPECT_EQ(sql("SELECT count(*) FROM MIRVAE WHERE IDENT = 'D1'") + lignesDe("D1"), "0");
  EXPECT_EQ(lignesDe("D10"), "D10|000001 706900 1.00");
  EXPECT_EQ(session().ecranCourant(), nullptr);
}

TEST_F(DocumentCycleTest, AbandoningALineDropsItAndAbandoningTheDocumentDropsTheChangesSinceTheLastSave) {
  documentEnregistre();
  ouvrirDocument("D1", "VMCAm");
  model::allerLigne(session(), 1);
  ASSERT_TRUE(model::saisir(session(), "LST_MIRVAL.NUMCP", "706999"));
  ASSERT_TRUE(model::abandonnerLigne(session()));
  EXPECT_EQ(model::valeur(session(), "LST_MIRVAL.NUMCP"), "706100");
  model::nouvelleLigne(session());
  model::abandonnerLigne(session());
  EXPECT_EQ(model::lignes(session()).size(), 2u);
  EXPECT_FALSE(document().lineInEntry());

  model::allerLigne(session(), 2);
  model::supprimerLigne(session());
  saisirLigne("706500", "1");
  journal.clear();
  ASSERT_TRUE(model::appuyer(session(), "ABAND_DOC"));
  EXPECT_EQ(journal.back(), "APRES_ABANDON");
  auto rows = model::lignes(session());
  ASSERT_EQ(rows.size(), 2u);
  EXPECT_EQ(rows[1].at("NUMCP"), "706200");
  EXPECT_EQ(lignesDe("D1"), "D1|000001 706100 10.00, D1|000002 706200 20.00");
}

TEST_F(DocumentCycleTest, AHandlerPutsTheCurrentLineIntoModification) {
  documentEnregistre();
  ouvrirDocument("D1", "VMCAm");
  model::allerLigne(session(), 2);
  EXPECT_FALSE(document().lineInEntry());
  ASSERT_TRUE(model::appuyer(session(), "SOLDER"));
  EXPECT_TRUE(document().lineInEntry());
  // The front end is asked to show the line's new values; the screen keeps nothing.
  EXPECT_EQ(user_.dernierDessin.fonctions.back(), std::make_pair(20, std::string("LST")));
  EXPECT_TRUE(model::ecranDevant(session()).ecran()->fonctions().empty());
  ASSERT_TRUE(model::validerLigne(session()));
  EXPECT_EQ(model::lignes(session()).at(1).at("HT"), "99.00");
  ASSERT_TRUE(model::appuyer(session(), "VALID_DOC"));
  EXPECT_EQ(lignesDe("D1"), "D1|000001 706100 10.00, D1|000002 706200 99.00");
}

TEST_F(DocumentCycleTest, AddedLinesAreNumberedAgainInTheirOrder) {
  model::ouvrir(session(), "TEST-MODELE_DOCUMENT");
  ASSERT_TRUE(model::appuyer(session(), "IMPORTER"));
  auto rows = model::lignes(session());
  ASSERT_EQ(rows.size(), 2u);
  EXPECT_EQ(rows[0].at("NUMERO") + " " + rows[0].at("NUMCP"), "|000001 706100");
  EXPECT_EQ(rows[1].at("NUMERO") + " " + rows[1].at("NUMCP"), "|000002 706300");
  ASSERT_TRUE(model::appuyer(session(), "VALID_DOC"));
  EXPECT_EQ(lignesDe("00000001"), "00000001|000001 706100 10.00, 00000001|000002 706300 10.00");
}

TEST_F(DocumentCycleTest, DuplicationKeepsTheHeaderAndMakesANewDocument) {
  documentEnregistre();
  ouvrirDocument("D1", "VMCAv");
  journal.clear();
  ASSERT_TRUE(model::appuyer(session(), "CREAT2"));
  EXPECT_EQ(journal, (std::vector<std::string>{"DEBUT_FICHE", "APRES_DEBUT_CREATION"}));
  EXPECT_EQ(document().modeCourant(), "C");
  EXPECT_EQ(model::valeur(session(), "MIRVAE.IDENT"), "");
  EXPECT_EQ(model::valeur(session(), "MIRVAE.NUMCP"), "411001");
  EXPECT_TRUE(model::lignes(session()).empty());
  saisirLigne("706100", "1");
  ASSERT_TRUE(model::appuyer(session(), "VALID_DOC"));
  EXPECT_EQ(sql("SELECT group_concat(IDENT || ' ' || NUMCP, ', ') FROM (SELECT * FROM MIRVAE WHERE TYPE = 'FC' "
                "ORDER BY IDENT)"),
            "00000001 411001, D1 411001");
  EXPECT_EQ(lignesDe("D1"), "D1|000001 706100 10.00, D1|000002 706200 20.00");
}

TEST_F(DocumentCycleTest, ModeStringsGiveTheAllowedModes) {
  struct Cas {
    const char* modes;
    const char* permis;  // of "CMVA"
  };
  for (const Cas& cas : {Cas{"VMCAv", "CMVA"}, Cas{"Vv", "V"}, Cas{"VMm", "MV"}, Cas{"", "CMVA"}}) {
    model::Saisie document(nullptr);
    document.modeSaisie(cas.modes);
    std::string permis;
    for (char m : std::string("CMVA"))
      if (document.modePermis(m)) permis += m;
    EXPECT_EQ(permis, cas.permis) << cas.modes;
  }
  model::Saisie document(nullptr);
  for (const char* wrong : {"VXv", "Vm", "vV", "VMCAvv"}) EXPECT_THROW(document.modeSaisie(wrong), HostError) << wrong;
}

}  // namespace
