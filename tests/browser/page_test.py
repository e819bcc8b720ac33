#!/usr/bin/python3
"""The browser page driven by headless Chromium: a person's road through the screens
of a fresh demo dossier, checked afterwards in the dossier itself.

    /usr/bin/python3 tests/browser/page_test.py build/mirvae [--screenshots DIR]

Skipped (exit 77) when Chromium, its driver or Selenium is missing."""

import os
import shutil
import sqlite3
import subprocess
import sys
import tempfile
import unittest

try:
    from selenium import webdriver
    from selenium.common.exceptions import WebDriverException
    from selenium.webdriver.chrome.service import Service
    from selenium.webdriver.common.by import By
    from selenium.webdriver.common.keys import Keys
    from selenium.webdriver.support.ui import WebDriverWait
except ImportError:
    webdriver = None

MIRVAE = None
CHROMEDRIVER = "/usr/bin/chromedriver"
WAIT = 90  # seconds: generous, for sanitizer builds on a busy machine


class Serveur:
    """`mirvae serve` on a fresh demo dossier, on a free port."""

    def __init__(self):
        self.dir = tempfile.mkdtemp(prefix="mirvae-navigateur-")
        self.dossier = os.path.join(self.dir, "dossier.db")
        subprocess.run([MIRVAE, "init", self.dossier, "--demo"], check=True, stdout=subprocess.DEVNULL)
        self.process = subprocess.Popen([MIRVAE, "serve", self.dossier, "--port", "0"],
                                        stdout=subprocess.PIPE, text=True)
        line = self.process.stdout.readline()
        self.adresse = next(w for w in line.split() if w.startswith("http://"))

    def sql(self, query):
        with sqlite3.connect(self.dossier) as db:
            return db.execute(query).fetchall()

    def impressions(self):
        folder = os.path.join(self.dir, "dossier-impressions")
        return sorted(os.listdir(folder)) if os.path.isdir(folder) else []

    def arreter(self):
        self.process.terminate()
        self.process.wait(timeout=30)
        shutil.rmtree(self.dir, ignore_errors=True)


def navigateur():
    options = webdriver.ChromeOptions()
    for arg in ("--headless=new", "--no-sandbox", "--disable-dev-shm-usage", "--window-size=1200,800",
                "--disable-gpu", "--lang=fr-FR"):
        options.add_argument(arg)
    return webdriver.Chrome(service=Service(executable_path=CHROMEDRIVER), options=options)


class Page:
    """One tab of the browser on the page, with the gestures a person makes."""

    def __init__(self, driver, handle):
        self.driver, self.handle = driver, handle

    def ici(self):
        self.driver.switch_to.window(self.handle)
        return self

    def attendre(self, condition, what):
        return WebDriverWait(self.driver, WAIT).until(lambda d: condition(), message=what)

    def libre(self):
        """Waits until no request is in flight."""
        self.attendre(lambda: self.driver.execute_script("return !('occupe' in document.body.dataset)"),
                      "la page reste occupée")

    def css(self, selector, root=None):
        return (root or self.driver).find_element(By.CSS_SELECTOR, selector)

    def tous(self, selector):
        return self.driver.find_elements(By.CSS_SELECTOR, selector)

    def ecran(self, code):
        self.attendre(lambda: self.css("#code").text == code, "écran " + code)
        self.libre()

    def champ(self, nom, root="#ecran"):
        return self.css(f'{root} input[data-nom="{nom}"]')

    def valeur(self, nom):
        return self.champ(nom).get_attribute("value")

    def taper(self, nom, texte, root="#ecran"):
        field = self.attendre(lambda: self.champ(nom, root), "champ " + nom)
        field.click()
        field.send_keys(Keys.CONTROL, "a")
        field.send_keys(texte, Keys.ENTER)
        self.libre()

    def appuyer(self, action):
        self.css(f'#ecran button[data-action="{action}"]').click()
        self.libre()

    def geste(self, geste, root="#ecran"):
        self.css(f'{root} button[data-geste="{geste}"]').click()
        self.libre()

    def repondre(self, valeur):
        self.attendre(lambda: self.css("dialog#question").get_attribute("open") is not None, "la question")
        self.css(f'dialog#question button[data-valeur="{valeur}"]').click()
        self.libre()

    def lignes(self):
        return self.tous("table#liste tbody tr:not(:has(td.vide))")

    def journal(self, sorte):
        return [e.text for e in self.tous(f"#journal .{sorte}")]

    def ouvrir_liste(self, kind=1):
        self.css(f'nav button[data-module="MIRVAE-ACCES{kind}"]').click()
        self.ecran(f"MIRVAE-ACCES{kind}")

    def saisir_facture(self, client, lignes):
        """From the client-invoice list: a new invoice with its lines, not yet saved."""
        self.appuyer("CREER")
        self.ecran("MIRVAE-GESTION1")
        self.taper("VLIBCP1", client)
        for compte, montant in lignes:
            self.geste("nouvelle_ligne")
            self.taper("LST_MIRVAL.NUMCP", compte)
            self.taper("LST_V_HT", montant)
            self.geste("valider_ligne")


class PageTest(unittest.TestCase):
    @classmethod
    def setUpClass(cls):
        cls.serveur = Serveur()
        try:
            cls.driver = navigateur()
        except Exception:
            cls.serveur.arreter()
            raise
        cls.driver.get(cls.serveur.adresse)

    @classmethod
    def tearDownClass(cls):
        cls.driver.quit()
        cls.serveur.arreter()

    def nouvel_onglet(self):
        self.driver.switch_to.new_window("tab")
        self.driver.get(self.serveur.adresse)
        page = Page(self.driver, self.driver.current_window_handle)
        page.attendre(lambda: page.css("nav button"), "le menu")
        page.libre()
        return page

    def test_1_une_facture_saisie_modifiee_et_imprimee(self):
        page = self.nouvel_onglet()
        page.ouvrir_liste(1)
        self.assertEqual(page.css("#titre").text, "Factures clients")
        page.saisir_facture("Brasserie Lissandre", [("706300", "1500"), ("708500", "80,00")])
        self.assertEqual(page.valeur("MIRVAE.NUMCP"), "411001")
        self.assertEqual(len(page.lignes()), 2)
        self.assertEqual([td.text for td in page.tous('table#liste td[data-colonne="MIRVAL.COTVA"]')], ["V10", "V20"])
        self.assertEqual((page.valeur("V_TOT_HT"), page.valeur("V_TOT_TVA"), page.valeur("V_TOT_TTC")),
                         ("1580,00", "166,00", "1746,00"))
        piece = page.valeur("MIRVAE.NPIEC")  # drawn with the first line
        self.assertRegex(piece, r"^VT\d+$")
        self.assertEqual(self.serveur.sql("SELECT count(*) FROM MIRVAE"), [(0,)])

        page.appuyer("B_VALID_DOC")
        page.repondre("1")  # Enregistrer, and the screen is ready for the next invoice
        self.assertEqual(page.journal("erreur"), [])
        self.assertEqual(page.valeur("MIRVAE.NPIEC"), "[PIECE]")

        page.geste("fermer")
        page.ecran("MIRVAE-ACCES1")
        self.assertEqual(len(page.lignes()), 1)
        self.assertEqual(page.css('table#liste td[data-colonne="NPIEC"]').text, piece)
        self.assertEqual(page.css('table#liste td[data-colonne="TTC"]').text, "1\u202f746,00")

        # Modified: the carriage goes to 120.
        page.lignes()[0].click()
        page.libre()
        page.appuyer("MODIFIER")
        page.ecran("MIRVAE-GESTION1")
        page.lignes()[1].click()
        page.libre()
        page.taper("LST_V_HT", "120")
        page.geste("valider_ligne")
        self.assertEqual(page.valeur("V_TOT_TTC"), "1794,00")
        page.appuyer("B_VALID_DOC")
        if page.css("dialog#question").get_attribute("open") is not None:
            page.repondre("1")
        self.assertEqual(page.journal("erreur"), [])
        self.assertEqual(self.serveur.sql("SELECT NPIEC, TTC + 0 FROM MIRVAE"), [(piece, 1794)])
        self.assertEqual(self.serveur.sql("SELECT MTDEB + 0 FROM MOUVE WHERE NUMCP = '411001'"), [(1794,)])
        self.assertEqual(self.serveur.sql("SELECT count(*) FROM PIECE"), [(1,)])

        # Its form, printed, opens in a tab of its own.
        tabs = set(self.driver.window_handles)
        page.appuyer("IMPR_FICHE")
        page.attendre(lambda: set(self.driver.window_handles) - tabs, "l'onglet de l'impression")
        self.assertTrue(any(name.endswith(".pdf") for name in self.serveur.impressions()), self.serveur.impressions())
        page.ici()
        page.geste("fermer")
        page.ecran("MIRVAE-ACCES1")

    def test_2_un_champ_interdit_et_un_controle_refuse(self):
        page = self.nouvel_onglet()
        page.ouvrir_liste(1)
        page.appuyer("CREER")
        page.ecran("MIRVAE-GESTION1")
        # The rate of the dossier's own currency is forbidden: greyed, not typed into.
        cours = page.champ("MIRVAE.COURS")
        self.assertFalse(cours.is_enabled())
        before = cours.get_attribute("value")
        try:
            cours.send_keys("2", Keys.ENTER)
        except WebDriverException:
            pass
        page.libre()
        self.assertEqual(page.valeur("MIRVAE.COURS"), before)
        # An unknown client is refused with the screen's message, the focus back on it.
        page.taper("VLIBCP1", "Personne")
        self.assertIn("Le compte Client est inexistant !", page.journal("message"))
        self.assertTrue(page.journal("refus"))
        self.assertEqual(self.driver.switch_to.active_element.get_attribute("data-nom"), "VLIBCP1")
        # F4 opens the choice window as a searchable picker.
        page.champ("VLIBCP1").send_keys(Keys.F4)
        page.attendre(lambda: page.css("dialog#question input.recherche").is_displayed(), "la fenêtre de choix")
        page.css("dialog#question input.recherche").send_keys("lissandre")
        page.css('dialog#question button[data-valeur="Brasserie Lissandre"]').click()
        page.libre()
        self.assertEqual(page.valeur("MIRVAE.NUMCP"), "411001")
        page.appuyer("B_ABAND_DOC")
        if page.css("dialog#question").get_attribute("open") is not None:
            page.repondre("oui")

    def test_3_deux_onglets_saisissent_en_meme_temps(self):
        a, b = self.nouvel_onglet(), self.nouvel_onglet()
        before = self.serveur.sql("SELECT count(*) FROM MIRVAE")[0][0]
        for page in (a, b):
            page.ici().ouvrir_liste(1)
            page.saisir_facture("Cabinet Vaillergues", [("706300", "100")])
        pieces = [a.ici().valeur("MIRVAE.NPIEC"), b.ici().valeur("MIRVAE.NPIEC")]
        self.assertNotEqual(pieces[0], pieces[1])
        for page in (a, b):
            page.ici().appuyer("B_VALID_DOC")
            page.repondre("1")
            self.assertEqual(page.journal("erreur"), [])
        self.assertEqual(sorted(p for (p,) in self.serveur.sql("SELECT NPIEC FROM MIRVAE WHERE NUMCP = '411003'")),
                         sorted(pieces))
        self.assertEqual(self.serveur.sql("SELECT count(*), count(DISTINCT NPIES) FROM MIRVAE")[0],
                         (before + 2, before + 2))

    def test_4_la_ventilation_analytique_dans_sa_fenetre(self):
        page = self.nouvel_onglet()
        page.ouvrir_liste(2)
        page.appuyer("CREER")
        page.ecran("MIRVAE-GESTION2")
        page.taper("VLIBCP1", "Scierie Maurel Frères")
        page.geste("nouvelle_ligne")
        page.taper("LST_MIRVAL.NUMCP", "601000")
        page.taper("LST_V_HT", "2400")
        page.geste("valider_ligne")
        page.lignes()[0].click()
        page.libre()
        page.appuyer("BT_ANALYTIQUE")
        page.attendre(lambda: page.css("dialog#modal").get_attribute("open") is not None, "l'écran analytique")
        self.assertEqual(page.css("dialog#modal .code-ecran").text, "MIRVAE-GEST_ANA")
        sections = lambda: [td.text for td in page.tous('dialog#modal td[data-colonne="MIRVAANA_M01.CSECT"]')]
        self.assertEqual(sections(), ["ATELIER", "CHANTIER"])
        page.css('dialog#modal button[data-action="VALID_DOC"]').click()
        page.libre()
        page.css('dialog#modal button[data-geste="fermer"]').click()
        page.libre()
        page.attendre(lambda: page.css("dialog#modal").get_attribute("open") is None, "le retour à la saisie")
        self.assertEqual(page.css("#code").text, "MIRVAE-GESTION2")
        self.assertEqual(page.journal("erreur"), [])
        page.appuyer("B_VALID_DOC")
        page.repondre("1")
        self.assertEqual(self.serveur.sql("SELECT group_concat(CSECT || ' ' || (MTADE + 0), ', ') FROM VTSEC JOIN MOUVE "
                                          "ON MOUVE.UNIQ = VTSEC.MOUVE_UNIQ WHERE NUMCP = '601000'"),
                         [("ATELIER 1440, CHANTIER 960",)])

    def test_5_un_reglement_justifie_dans_sa_fenetre(self):
        # The bank receipt of the invoice of the first case opens the justification
        # screen inside its line's validation; the due date is settled on it.
        page = self.nouvel_onglet()
        page.ouvrir_liste(4)
        page.appuyer("CREER")
        page.ecran("MIRVAE-GESTION4")
        page.geste("nouvelle_ligne")
        page.taper("LST_MIRVAL.NUMCP", "411001")
        page.taper("LST_V_HT", "1794")
        modal = lambda: page.css("dialog#modal").get_attribute("open") is not None
        if not modal():
            page.geste("valider_ligne")
        page.attendre(modal, "l'écran de justification")
        self.assertEqual(page.css("dialog#modal .code-ecran").text, "MIRVAE-GEST_JUS")
        page.css("dialog#modal table tbody tr").click()
        page.libre()
        page.css('dialog#modal button[data-action="BT_MT_REGLEMENT"]').click()
        page.libre()
        page.css('dialog#modal button[data-action="VALID"]').click()
        page.libre()
        page.attendre(lambda: not modal(), "le retour à la saisie")
        self.assertEqual(page.css("#code").text, "MIRVAE-GESTION4")
        self.assertEqual(page.journal("erreur"), [])
        page.appuyer("B_VALID_DOC")
        page.repondre("1")
        self.assertEqual(page.journal("erreur"), [])
        self.assertEqual(self.serveur.sql("SELECT count(*) FROM ECHEA JOIN MOUVE ON MOUVE.UNIQ = ECHEA.UNIQ "
                                          "WHERE NUMCP = '411001' AND UNIQR = 0"), [(0,)])
        self.assertEqual(self.serveur.sql("SELECT count(DISTINCT RELET), min(RELET = upper(RELET) AND RELET <> '') "
                                          "FROM MOUVE WHERE NUMCP = '411001'"), [(1, 1)])


def captures(folder):
    """The README's pictures: the entry screen of an invoice with its lines, and the list."""
    serveur = Serveur()
    driver = navigateur()
    try:
        driver.get(serveur.adresse)
        page = Page(driver, driver.current_window_handle)
        page.attendre(lambda: page.css("nav button"), "le menu")
        page.ouvrir_liste(1)
        for client, lignes in (("Brasserie Lissandre", [("706300", "1500"), ("708500", "80")]),
                               ("Gîtes du Moulin Bas", [("706300", "2340,50")])):
            page.saisir_facture(client, lignes)
            page.appuyer("B_VALID_DOC")
            page.repondre("1")
            page.geste("fermer")
            page.ecran("MIRVAE-ACCES1")
        page.saisir_facture("SCI Berthomieu", [("706300", "4200"), ("708500", "135,40")])
        page.champ("MIRVAE.INPIE").click()
        driver.save_screenshot(os.path.join(folder, "entree.png"))
        page.geste("abandonner_ligne") if page.tous('tr.courante') else None
        page.appuyer("B_ABAND_DOC")
        if page.css("dialog#question").get_attribute("open") is not None:
            page.repondre("oui")
        page.ecran("MIRVAE-ACCES1")
        page.lignes()[0].click()
        page.libre()
        driver.save_screenshot(os.path.join(folder, "liste.png"))
    finally:
        driver.quit()
        serveur.arreter()


if __name__ == "__main__":
    if webdriver is None or not os.path.exists(CHROMEDRIVER):
        print("Chromium, chromium-driver ou python3-selenium manque : test sauté")
        sys.exit(77)
    MIRVAE = os.path.abspath(sys.argv.pop(1))
    if len(sys.argv) > 2 and sys.argv[1] == "--screenshots":
        captures(sys.argv[2])
        sys.exit(0)
    unittest.main(verbosity=2)
