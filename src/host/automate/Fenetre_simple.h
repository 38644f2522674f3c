// A plain window: created with its parameters, it runs "INIT", "AVANT_DEBUT", "DEBUT" and
// "DEBUT_ACTIVATION" (those bound) and then stays open in its session until a handler ends it
// with `sortir`; it gets "DEBUT_ACTIVATION" again when an automaton it launched has ended. Its
// screen (`ecran()`) is built from the description of `nomEcran()`.
//
// A person works it through the screen model, which checks each action (the control exists, is
// enabled, visible and on the current tab; the text converts to the field's kind) and then calls
// the operation below that does what the person's action does. Each runs the handlers the
// runtime raises for that action and answers false when the window refuses it: a handler
// rejected its event (`rejeter`), and what it refused is undone (a field keeps its old value).
// An outcome a handler reports (`erreurMethode`) is not a refusal: the import window reports
// that errors were found, having done its work. Document windows override these operations
// with their own events.
//
// A list of the screen may show a table (`listeSur`): its rows are the rows the cursor's
// criteria select, each column the table column its description names. The window redraws it
// by program (`afficherListe`), which raises "<list>_LISTE_VIDE" or "<list>_LISTE_PLEINE"; a row
// chosen puts the cursor on it and raises "<list>_SELECTION"; a cell changed is written to the
// cursor's row, then the column's label runs with the cursor on that row (its handler updates
// the row and may refuse, which puts the old value back).
#pragma once

#include <map>
#include <string>
#include <vector>

#include "host/automate/Automate.h"
#include "host/table/Store.h"

namespace quarvo::host {

class Fenetre_simple : public Automate {
 public:
  using Automate::Automate;
  bool estFenetre() const override { return true; }
  void executer(Evt* evt) override;

  // A value typed in `field` (already converted to its kind): the field takes it, then the
  // labels the description gives for the field run in order (by default the field's name).
  virtual bool saisirChamp(Field& field, const Valeur& value,
                           const std::vector<std::string>& labels);
  // A cell edited (row from 1): the row becomes current, the cell takes the text, then the
  // column's label runs.
  virtual bool saisirCellule(const std::string& list, size_t row, const std::string& column,
                             const std::string& text);
  // A row chosen (from 1): it becomes the current row.
  virtual bool selectionnerLigne(const std::string& list, size_t row);
  // A tab asked for: its request label runs (a handler may refuse it); then the tab is current
  // and its entry label ("<tab>_ENTREE") runs.
  virtual bool demanderOnglet(const std::string& tab);
  // A button pressed: its label runs.
  virtual bool presserBouton(const std::string& button);
  // A line added at the end of a list, then current; a line deleted.
  virtual bool nouvelleLigne(const std::string& list);
  virtual bool supprimerLigne(const std::string& list, size_t row);
  // The window's close box. With changes not saved, the window asks first whether to leave
  // them; otherwise, or on yes, the window ends.
  virtual void fermer();

  // A list shown from a table. REQUIRES: `cursor` outlives the window's use of the list.
  void listeSur(const std::string& list, Table& cursor);
  // Redraws a list from its table's selection; the current row stays on the same table row when
  // it is still shown. Returns the number of rows.
  size_t afficherListe(const std::string& list);

 protected:
  // Raises `label` as a person's action does; false when the handler refused it. A label no
  // handler is bound to refuses nothing.
  bool leverAction(const std::string& label);

 private:
  struct ListeTable {
    Table* curseur = nullptr;
    std::vector<RowId> lignes;
  };
  std::map<std::string, ListeTable> listesTables_;
};

}  // namespace quarvo::host
