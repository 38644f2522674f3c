// A traversal of one table: "DEBUT", then for each row of the selection in the sort plan's
// order "POUR_TOUT", with level-1 breaks ("DEBUT1" before the first row of a group, "FIN1" after
// its last) on the break column, then "FIN". The automaton names its table with `nomTable`,
// its criteria with `critere` and its order and break with `plan`. "POUR_TOUT" reads the current
// row through the traversal cursor `courant()`. "SORTIE" (when bound) runs once at the very end,
// whether the traversal ended by itself or a handler ended it early; a class whose own handlers
// raise "SORTIE" earlier says so with `sortieFaite`.
#pragma once

#include <memory>

#include "host/automate/Automate.h"
#include "host/table/Table.h"

namespace quarvo::host {

// How two values of a sort column compare: below 0, 0 or above 0.
using Comparaison = int (*)(const Valeur&, const Valeur&);

// The rows `t`'s criteria select, in the order of `colonnes` compared by `comparer`, ties in key
// order. With the values' own comparison the store orders them itself when it can.
std::vector<RowId> selectionTriee(Table& t, const std::vector<std::string>& colonnes,
                                  Comparaison comparer = Valeur::compare);

class Parcours : public Automate {
 public:
  explicit Parcours(Evt* creating);
  ~Parcours() override;

  // Sort columns (in order) and the level-1 break column (empty: no breaks).
  void plan(std::vector<std::string> sortColumns, std::string breakColumn = {});
  void critere(const std::string& column, char op, const Valeur& value);
  Table& courant();
  // Stops the traversal after the current row.
  void arreter() { stop_ = true; }
  // The exit handler has run: it is not raised again at the end.
  void sortieFaite() { sortieFaite_ = true; }
  void executer(Evt* evt) override;

 private:
  std::unique_ptr<Table> cursor_;
  std::vector<std::string> sort_;
  std::string break_;
  std::vector<Criterion> criteria_;
  bool stop_ = false;
  bool sortieFaite_ = false;
};

}  // namespace quarvo::host
