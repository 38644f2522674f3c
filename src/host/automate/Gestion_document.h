// A document on work tables: a header found by its key in the document's main table, and lines
// the derived document selects on a cursor of its own, shown in the list "LST"; a second list
// may show what another cursor selects (the derived document sets its criteria and redraws it).
//
// Life: opened with the header's key, it reads the header (a window that cannot read it says so
// and does not open), raises "DEBUT_FICHE", shows the lines ("LST_LISTE_VIDE" or
// "LST_LISTE_PLEINE") and raises "DEBUT_FICHE_LIGNE" on the first line, then on every change of
// current line. A new line is asked of "CTRL_CREE_LIGNE": the base makes none, so a document
// whose handler does not make one has fixed lines. "VALIDATION" (the OK button "VALID"), when
// not refused, is followed by the base writing the header back and closing the window; every
// other close ("ABANDON", the close box) raises "APRES_ABANDON" first. The title is the
// description's until the document sets it (`titre`).
#pragma once

#include <string>

#include "host/automate/Fenetre_simple.h"
#include "host/table/Table.h"

namespace quarvo::host {

class Gestion_document : public Fenetre_simple {
 public:
  explicit Gestion_document(Evt* creating);

  void executer(Evt* evt) override;

  // Set-up by the derived constructor: the header's key column and its value (a field bound to
  // the creating parameter), and the cursor of the lines (the derived sets its criteria).
  void entetePar(const std::string& column, Field& key, Table& lignes);
  // The header: the main table's row of the document, current on this cursor.
  Table& entete() { return *entete_; }
  Table& lignes() { return *lignes_; }
  void titre(const std::string& text);
  // Redraws the lines from the lines cursor.
  void afficherLignes();

  bool selectionnerLigne(const std::string& list, size_t row) override;
  bool nouvelleLigne(const std::string& list) override;
  bool presserBouton(const std::string& button) override;
  void fermer() override;

 private:
  void valider();
  void abandonner();

  std::unique_ptr<Table> entete_;
  Table* lignes_ = nullptr;
  std::string colonneCle_;
  Field* cle_ = nullptr;
};

}  // namespace quarvo::host
