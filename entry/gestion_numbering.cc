// Piece numbering. The journal of the operation says whether its pieces are numbered
// by hand or drawn from its counter, with prefixes built from the operation's year
// and month. "[PIECE]" stands for a number not drawn yet: in NPIEC until the number
// is drawn, in INPIE until the number replaces it.
#include <chrono>

#include "entry/gestion.h"
#include "host/text.h"

namespace entry {

using host::text::kPiecePlaceholder;

void EntryScreen::npiec_entree(Evt*) { procedure("PREFIXE_NUMERO_PIECE"); }

void EntryScreen::prefixe_numero_piece(Evt*) {
  lireJournal();
  if (JONAL_NUMEROPI == "A" || JONAL_PREFIXPI.estVide()) return;
  // The prefix is made of the operation's year and month: none before the date is known.
  std::string yearMonth = anneeMois();
  if (yearMonth.empty()) return;
  if (MIRVAE_NPIEC == kPiecePlaceholder) {
    MIRVAE_NPIEC = prefixe(JONAL_PREFIXPI, yearMonth);
    ecran()->affiche("NPIEC", "");
  }
}

void EntryScreen::npiec(Evt* e) {
  lireJournal();
  bool automatique = JONAL_NUMEROPI == "A";
  if (MIRVAE_NPIEC.estVide() && !automatique) {
    messageOk(libelle("0413"));
    Message::nettoie(this);
    controler("NPIEC");
    rejeter(e);
    return;
  }
  if (!MIRVAE_NPIEC.estVide() && !automatique && MIRVAE_INPIE.position(kPiecePlaceholder) > 0) {
    remplacerPieceDansLibelle();
    ecran()->affiche("INPIE", "");
  }
  if (MIRVAE_NPIEC != kPiecePlaceholder && automatique) {
    bool oui = question("Le journal " + MIRVAE_NUMJL.chaine() + " est défini avec une numérotation automatique." +
                        "@Confirmez-vous la saisie du N° pièce ?");
    V_CHOIX = oui ? 1 : 0;
    if (V_CHOIX != "1") {
      MIRVAE_NPIEC = kPiecePlaceholder;
      ecran()->affiche("NPIEC", "");
      controler("NPIEC");
      rejeter(e);
    }
  }
}

void EntryScreen::inpie_entree(Evt*) { procedure("PREFIXE_INTITULE_PIECE"); }

void EntryScreen::prefixe_intitule_piece(Evt*) {
  lireJournal();
  if (JONAL_PREFIXIN.estVide()) return;
  std::string yearMonth = anneeMois();
  if (yearMonth.empty()) return;
  if (MIRVAE_INPIE.estVide()) {
    MIRVAE_INPIE = prefixe(JONAL_PREFIXIN, yearMonth) + " " + MIRVAE_NPIEC.chaine();
    ecran()->affiche("INPIE", "");
  }
}

// The number is drawn when the user leaves the header for the lines: the date and
// the journal are known by then.
void EntryScreen::lst_entree(Evt*) {
  if (!enCreation()) return;
  procedure("INCREMENTE_NUMERO_PIECE");
  if (refuse()) return;
  if (MIRVAE_INPIE.position(kPiecePlaceholder) > 0) remplacerPieceDansLibelle();
  ecran()->affiche("NPIEC", "INPIE", "");
}

void EntryScreen::incremente_numero_piece(Evt* e) {
  lireJournal();
  if (MIRVAE_NPIEC != kPiecePlaceholder || JONAL_NUMEROPI != "A") return;
  // The counter's period comes from the date: nothing is drawn before it is known.
  std::string yearMonth = anneeMois();
  if (yearMonth.empty()) return;

  Chaine V_MOIS_NUMERO_PIECE("V_MOIS_NUMERO_PIECE", "", "", 4, this);
  Double V_NUMERO_PIECE("V_NUMERO_PIECE", "N° pièce calculé", "-#,###,###,##0", 4, this);
  Entier V_ERREUR_NUMERO_PIECE("V_ERREUR_NUMERO_PIECE", "", "", 4, this);
  if (JONAL_RAZPI == "O") {
    V_MOIS_NUMERO_PIECE = yearMonth;
  } else {
    using std::chrono::days;
    using std::chrono::sys_days;
    // After the last day of the exercise, the piece belongs to the next one.
    Jour end = PARAM_PDFEX.jour();
    bool nextExercise = end && sys_days(*MIRVAE_DTOPE.jour()) >= sys_days(*end) + days(1);
    V_MOIS_NUMERO_PIECE = nextExercise ? "N+1" : "N";
  }
  Chaine journal(JONAL_NUMJL.chaine());
  EvtParamRef compteur(4, &journal, &V_MOIS_NUMERO_PIECE, &V_NUMERO_PIECE, &V_ERREUR_NUMERO_PIECE);
  compta("INCREMENTE_NUMERO_PIECE", &compteur);

  if (V_ERREUR_NUMERO_PIECE == 1) messageOk("N° de pièce impossible à modifier dans la table NUMPI");
  if (V_ERREUR_NUMERO_PIECE == 2) {
    messageOk("La numérotation automatique de la pièce@est déjà réservée...Recommencez");
    controler("NPIEC");
    rejeter(e);
    return;
  }
  MIRVAE_NPIEC = std::to_string(V_NUMERO_PIECE.entier());
  if (!JONAL_PREFIXPI.estVide()) MIRVAE_NPIEC = prefixe(JONAL_PREFIXPI, yearMonth) + MIRVAE_NPIEC.chaine();
}

}  // namespace entry
