// A document window: a header and a list of lines, the lines being rows of the document's main
// table selected by one column (the link rows of one budget line, say).
//
// The document copies its lines into the session's memory table "MEM:<main table>" when it
// opens; everything a person changes stays there until the document is saved, when the base
// writes the differences back to the main table (rows added, changed, deleted) inside one
// transaction that also holds what the derived document's "SAUVEGARDE" does around it; leaving
// without saving, or abandoning, leaves the database as it was. The current line is the buffer of
// `ligne()`, a cursor on the memory table: handlers read and write its columns.
//
// Modes: the creating parameter "PMODE" may carry several letters; upper case are the functions
// a person may use ("V" view, "C" new line, "M" modify a line, "A" delete a line), lower case the
// line rights handed on to the pieces' own documents. The document opens in "V"; a function whose
// letter is absent is refused. The current mode ("C" while a new line is entered, "M" while a line
// is changed or changes wait for the save, "V" otherwise) is the screen's mode.
//
// Events, as a person's actions raise them (each a label the derived document may bind):
// opening: "DEBUT_TRI" (before the lines are read), then "DEBUT", then "DEBUT_LIGNE" and
// "AFFICHER_LIGNE" on the first line shown, or "DEBUT_FICHE_VIDE" when none is; a row chosen:
// the line being entered is validated first, then "DEBUT_LIGNE", "AFFICHER_LIGNE"; a new line:
// "DEBUT_CREATION", "CREATION"; a cell of an existing line changed in "V": "DEBUT_MODIFICATION",
// "MODIFICATION" (either may refuse), then the column's label; a line validated (another row
// chosen, "B_VALID_LIGNE", a save): "VALIDATION" (may refuse), then "FIN_CREATION" or
// "FIN_MODIFICATION"; a line deleted: "AVANT_SUPPRESSION" (may refuse), "APRES_SUPPRESSION";
// "VALID_DOC" saves ("SAUVEGARDE"), "ABAND_DOC" forgets the changes, "REDEMARRE" reads the lines
// again; leaving: the question "VOULEZ_VOUS_SAUVER" when changes are pending, then
// "AVANT_SORTIE", whose failure keeps the document open (restarted). Before the base asks one of
// its questions it raises "DIALOGUE" (type by value, answer by reference): an answer set there is
// taken without asking.
//
// Buttons the base answers itself: "MODIFICATION" (modify the current line), "SUPPR" (delete it),
// "B_VALID_LIGNE", "B_ABAND_LIGNE" (validate or abandon the line being entered). The base also
// keeps the document's integer setting (`parametre`) and the indicator that nothing is left
// unsaved (`indicateur`, 1 when the document holds no change).
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "host/automate/Fenetre_simple.h"
#include "host/table/Table.h"

namespace quarvo::host {

class Gestion_doc : public Fenetre_simple {
 public:
  explicit Gestion_doc(Evt* creating);
  ~Gestion_doc() override;

  void executer(Evt* evt) override;

  // Set-up by the derived constructor: the lines are the main table's rows whose `column`
  // equals `value`'s value when the document opens; `liste` is the screen's list of lines.
  void lignesDe(const std::string& column, Field& value, const std::string& liste = "LST");
  void modes(const std::string& pmode) { droits_ = pmode; }
  void parametre(int64_t value) { parametre_ = value; }
  int64_t parametre() const { return parametre_; }
  int indicateur() const { return modifie_ || enSaisie() ? 0 : 1; }

  // The current line (the row buffer of the memory table) and whether one is being entered.
  Table& ligne() { return *ligne_; }
  bool enSaisie() const { return nouvelle_ || saisie_; }
  // The document's mode: "C" while a new line is entered, "M" while a line is changed or the
  // document holds changes not saved, "V" otherwise.
  char mode() const { return nouvelle_ ? 'C' : (saisie_ || modifie_) ? 'M' : 'V'; }
  bool permis(char function) const;
  // The memory table's name ("MEM:QUARVO").
  const std::string& memoire() const { return memoire_; }
  // The identifier of the line deleted last ("APRES_SUPPRESSION" reads it).
  const std::string& identSupprime() const { return supprime_; }

  // Operations the derived document reaches by label or calls as "the base operation".
  virtual void sauvegarde(Evt* evt);  // writes the lines' changes to the main table
  void visualisation(Evt* evt);       // abandons the line being entered
  void ajouter_ligne(Evt* evt);       // appends the current buffer as a new line
  void valid_doc(Evt* evt);
  void aband_doc(Evt* evt);
  void redemarre(Evt* evt);
  void ctrl_debut_modif(Evt* evt);  // a line about to change: modification mode on it
  // Shows the lines again (after a change of group, a piece added, ...).
  void rafraichir();
  // Starts a new line (mode "C"): a prepared buffer, "DEBUT_CREATION", "CREATION".
  bool creerLigne();

  // A person's actions on the document.
  bool saisirCellule(const std::string& list, size_t row, const std::string& column,
                     const std::string& text) override;
  bool selectionnerLigne(const std::string& list, size_t row) override;
  bool presserBouton(const std::string& button) override;
  bool nouvelleLigne(const std::string& list) override;
  bool supprimerLigne(const std::string& list, size_t row) override;
  void fermer() override;

 protected:
  // Whether a line of the memory table (current row of `lignes`) is shown; all by default.
  virtual bool ligneAffichee(Table& lignes);
  // Asks one of the base's questions through "DIALOGUE" first; returns the button (1-based).
  int demander(const std::string& type, const std::string& text,
               const std::vector<std::string>& buttons);

 private:
  bool validerLigne();
  void abandonnerLigne();
  // `personne`: asked by a person's action, which the screen's "MODIFICATION" control governs.
  bool entrerModification(bool personne);
  bool choisirLigne(size_t row);
  void charger();
  void devenirCourante(size_t index);
  // The first line shown becomes current; without one, the document says it is empty
  // ("DEBUT_FICHE_VIDE", "LST_LISTE_VIDE"). False when there is none.
  bool montrerPremiereLigne();
  bool quitter();

  Field* valeurCle_ = nullptr;
  std::string colonneCle_;
  std::string liste_ = "LST";
  std::string memoire_;
  std::string droits_ = "V";
  std::unique_ptr<Table> ligne_;  // the current line: a cursor on the memory table
  std::vector<RowId> affichees_;  // memory rows shown, in key order
  size_t courante_ = 0;           // index in affichees_ + 1; 0 when none
  bool nouvelle_ = false;         // the buffer is a new line not yet in the memory table
  bool saisie_ = false;           // the buffer is a line of the memory table being changed
  bool modifie_ = false;          // lines changed since the document was read
  int64_t parametre_ = 0;
  std::string supprime_;
  int redemarrages_ = 0;
  RowId avantCreation_ = 0;  // the current line when a new one was started
};

}  // namespace quarvo::host
