// Entry documents, the line side (Sdocum): the line list over the line table,
// through the document's memory image.
//
// Configuration (configureDocument): the header groups entered before the list
// ("P1,GRP1,LST"), the list's name ("LST") and the line table ("MIRVAL"). A line
// belongs to its header through NUMERO: the header's IDENT, "|", then the line's
// order on 6 digits, so that "begins with IDENT|" selects a document's lines in
// order and every line has its own NUMERO.
//
// The memory image of the line table ("MEM:MIRVAL", which the screen may declare
// under its own alias, "MEM_MIRVAL") holds the lines being entered. When a
// document opens, the image is filled with the line table's rows whose NUMERO
// begins with IDENT + "|", in key order, numbered again from 1; for each,
// "EXTRACTION_DONNEES" runs with the line table's buffer on that line. Saving
// (Saisie::validation) deletes the saved lines ("SUPPRESSION_DONNEES" before each)
// and writes the image's lines with their final NUMERO ("VALIDATION_DONNEES" after
// each). Handlers may read and change the image through their own binding.
//
// The current line is the line table binding's buffer (the handlers read
// MIRVAL.xxx). Never write that buffer with ecrit(): the model stores the line into
// the image when it is validated, and the image reaches the line table when the
// document is saved. Apply list function 20 (Ecran::fonction(20, "LST")) to show a
// changed line.
//
// Line cycle, driven by the user (model/mains.h):
//   - entering the list from the header runs "<group>_SORTIE" for each header group
//     before the list, then "<list>_ENTREE"; a refusal keeps the user in the header;
//   - going to line n: the line is read into the buffer, "SELECTION" runs (the
//     line's display variables), then "CTRL_DEBUT_LIGNE" (a refusal leaves no line
//     current);
//   - a new line: blank buffer, "CTRL_DEBUT_LIGNE", then "DEBUT_CREATION_LIGNE";
//   - typing into a column ("LST_MIRVAL.NUMCP", "LST_V_HT") puts an existing line
//     into modification ("CTRL_DEBUT_MODIF_LISTE") and runs the column's branch;
//   - validating: "VALIDATION_LIGNE", whose base stores the line into the image (a
//     refusal before the base keeps the line in entry), then "SELECTION" and
//     "APRES_VALIDATION_LIGNE";
//   - deleting: the line leaves the image, then "APRES_SUPPRESSION_LIGNE";
//   - abandoning: "APRES_ABANDON_LIGNE", whose base drops the line in entry.
// Nothing of this is allowed in visualisation.
#pragma once

#include <map>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "host/table.h"
#include "model/row_text.h"
#include "model/saisie.h"

namespace model {

class Sdocum : public Setape {
 public:
  explicit Sdocum(Evt* e);
  ~Sdocum() override;

  // Header groups entered before the list, in order and comma-separated (the
  // list's own name may end them), the list's name and the line table's name.
  void configureDocument(const char* headerGroups, const char* list, const char* lineTable);
  const std::string& listName() const { return list_; }
  // The line table binding (the current line), or null for a document without lines.
  Table* lineTable() const { return line_; }

  // Refuses control `name`: the focus goes back to it (an empty name refuses the
  // document's validation as a whole). The caller then rejects its event.
  void controler(const char* name);
  using Automate::controler;
  // Last control refused ("" when none since the last user action).
  const std::string& refusedControl() const { return refused_control_; }
  void forgetRefusedControl() { refused_control_.clear(); }

  // ---- standard events; each is the base of the branch of its upper-case name
  // "DIALOGUE": parameters TYPE (text) and REPONSE (integer, returned). The base
  // asks the user a yes/no question: for "VA_CREAT", whether to go on creating once
  // a creation was saved (REPONSE 1 yes, 0 no).
  virtual void dialogue(Evt* e);
  // "APRES_VALIDATION", "APRES_DEBUT_CREATION", "APRES_ABANDON": after those steps;
  // the base does nothing.
  virtual void apres_validation(Evt* e);
  virtual void apres_debut_creation(Evt* e);
  virtual void apres_abandon(Evt* e);
  // "CTRL_DEBUT_LIGNE": a line is entered; the base accepts.
  virtual void ctrl_debut_ligne(Evt* e);
  // "DEBUT_CREATION_LIGNE": a new line starts; the base does nothing.
  virtual void debut_creation_ligne(Evt* e);
  // "VALIDATION_LIGNE": stores the line in entry into the image (a new line at the
  // end). A handler calls it once its checks passed.
  virtual void validation_ligne(Evt* e);
  // "APRES_VALIDATION_LIGNE", "APRES_SUPPRESSION_LIGNE": the base does nothing.
  virtual void apres_validation_ligne(Evt* e);
  virtual void apres_suppression_ligne(Evt* e);
  // "APRES_ABANDON_LIGNE": drops the line in entry, if any (a handler may queue it).
  virtual void apres_abandon_ligne(Evt* e);
  // Data steps, run per line with the line table's buffer on the line; the base
  // does nothing. "EXTRACTION_DONNEES" when a document opens, "SUPPRESSION_DONNEES"
  // per saved line before it is deleted, "VALIDATION_DONNEES" per line written.
  virtual void extraction_donnees(Evt* e);
  virtual void validation_donnees(Evt* e);
  virtual void suppression_donnees(Evt* e);
  // "SELECTION": a line is shown; the base does nothing.
  virtual void selection(Evt* e);
  // "CTRL_CACHE_COLONNE ", "CTRL_CUSTOM_COLONNE": the list's columns; the base does
  // nothing.
  virtual void ctrl_cache_colonne(Evt* e);
  virtual void ctrl_custom_colonne(Evt* e);
  // "CTRL_DEBUT_MODIF_LISTE": parameter 0 the list's name; the current line enters
  // modification. Refused in visualisation or when no line is current.
  virtual void ctrl_debut_modif_liste(Evt* e);
  // "AJOUTER_LIGNE": adds the line table's buffer as a new line at the end of the
  // image (its NUMERO is given by the model).
  virtual void ajouter_ligne(Evt* e);
  // "RENUMEROTE_LIGNES": numbers the image's lines again from 1, in their order.
  virtual void renumerote_lignes(Evt* e);

  // ---- the list, for the user's hands (model/mains.h); each returns false when
  // refused. They run the steps above and must be called inside a user action.
  bool enterList();
  bool newLine();
  bool goToLine(int n);
  bool validateLine();
  bool deleteLine();
  bool abandonLine();
  // Puts the current line into modification if it is not already.
  bool beginLineChange();
  // The focus is back in the header: the list will be entered again.
  void leaveList() { in_list_ = false; }
  // When a handler redisplayed the list, shows every line again ("SELECTION" per
  // line, so that what a line shows follows the header, the amount mode or the
  // currency), the current one last and as it stands in entry.
  void catchUpList();

  void keepState(host::Snapshot& snapshot) override;

  // Lines of the image, in order, as shown: "MIRVAL.NUMCP" and "NUMCP" for the
  // fields, and the variables as "SELECTION" last left them for that line.
  std::vector<RowText> rows();
  // Current line (from 1), 0 for a new line or none.
  int currentLine();
  bool lineInEntry() const { return in_entry_; }
  bool hasCurrentLine() const { return current_.has_value(); }

 protected:
  bool closeLineEntry() override;
  void discardLineEntry() override;
  void loadLines(bool extract) override;
  void clearLines() override;
  void saveLines(const std::string& ident) override;
  void deleteLines(const std::string& ident) override;

 private:
  Table& image();
  Table& saved();
  std::string prefix(const std::string& ident) const { return ident + "|"; }
  std::string numero(const std::string& ident, int order) const;
  // NUMERO of every image line, in order.
  std::vector<std::string> imageNumeros();
  bool readImageLine(const std::string& numero);
  void showLine(const std::string& numero);
  bool refusedInVisu();

  std::string header_groups_, list_, line_table_name_;
  Table* line_ = nullptr;
  std::unique_ptr<Table> image_, saved_lines_;
  // NUMERO of the current line in the image; "" for a new line; none when no line.
  std::optional<std::string> current_;
  bool in_entry_ = false;
  bool in_list_ = false;
  bool line_stored_ = false;
  std::map<std::string, std::map<std::string, std::string>> shown_variables_;
  std::string refused_control_;
};

}  // namespace model
