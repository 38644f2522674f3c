// One action of a person on the screens, as plain data, and its script form.
//
// Every driver sends these to the screen model: a script (tests, `quarvo screen`), the
// terminal, the web page. The script form is one action per line; rows and columns count from
// 1; a column is its number or its name; VALUE is the rest of the line (it may hold spaces, and
// may be empty):
//
//   set FIELD VALUE        cell LIST ROW COLUMN VALUE     select LIST ROW
//   tab NAME               press BUTTON                   new LIST
//   delete LIST ROW        answer N|TEXT|PATH             close
//
// Blank lines and lines starting with '#' are not actions (a script may comment itself).
#pragma once

#include <cstddef>
#include <optional>
#include <string>

namespace quarvo::host {

struct Action {
  enum class Genre {
    Saisir,
    Cellule,
    Selectionner,
    Onglet,
    Presser,
    Nouvelle,
    Supprimer,
    Repondre,
    Fermer
  };
  Genre genre = Genre::Fermer;
  std::string cible;    // the field, list, tab or button
  size_t ligne = 0;     // from 1
  std::string colonne;  // a number from 1, or a name
  std::string valeur;   // the text typed, or the answer
  // The screen the driver acts on, when it says so; the action is refused unless that screen
  // is the innermost window. Empty: the innermost window, whichever it is.
  std::string fenetre;
};

// The action a script line gives. Nothing, with `erreur` (when given) saying why, for a line
// that is not an action; nothing and no error for a blank or comment line.
std::optional<Action> lireAction(const std::string& line, std::string* erreur = nullptr);
// The script line of an action.
std::string enLigne(const Action& action);

}  // namespace quarvo::host
