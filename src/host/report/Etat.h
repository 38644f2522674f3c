// The layout of a printed report, as the report engine reads it: parts, each walking one table
// of the automaton (its handle found by context or name, so the automaton's handlers see the
// row being printed), in a sort order, with break levels and printed bands.
//
// A band is a list of cells over the part's columns. A cell is an expression: terms joined by
// " & "; a term is 'literal text', "+COLUMN" (the sum of that amount column over the group the
// band closes, or over the whole part in its total), or a name the engine evaluates on the
// automaton (a field, or "TABLE.COLUMN" of a handle or interface record). Amounts print as
// "1 234,50"; a band with `zerosMasques` leaves zero amounts blank. A band prints when its
// condition holds: items joined by ",", each "NAME" (not empty and not 0), "!NAME", "NAME=text"
// or "NAME!=text".
//
// Labels the engine raises on the automaton (unbound labels are skipped), with the part's
// prefix ("LST_" for the first): "<prefix>DEBUT<n>" before the heading bands of level n,
// "<prefix>CORPS_IMPRIME" before the body bands of each row, "<prefix>FIN<n>_IMPRIME" before
// the closing bands of level n (the cursor then stands on the group's last row).
//
// A part without body bands whose break columns lead its sort order prints only group totals:
// the engine gathers them in one pass over the table, in the table's order, instead of sorting
// it; the headings and totals print as the sorted walk would print them (on the group's first
// and last rows in that order), and no body label is raised.
#pragma once

#include <map>
#include <string>
#include <vector>

#include "host/report/Document.h"
#include "host/value/Monnaie.h"

namespace quarvo::host::report {

struct Bande {
  std::vector<std::string> cellules;
  std::vector<int> colonnes;  // columns spanned by each cell (1 when absent)
  Style style;
  std::string condition;
  bool pleineLargeur = false;  // one text over the page width
  bool zerosMasques = false;
};

struct Niveau {
  std::string rupture;  // the column whose change opens a new group
  std::vector<Bande> debut;
  std::vector<Bande> fin;
  std::string saut;  // condition: each group starts on a new page
};

struct Partie {
  std::string table;  // handle context or table name in the automaton
  std::string condition;
  std::string titre;  // expression printed as the part's heading (on a new page)
  std::vector<std::string> tri;
  std::vector<Colonne> colonnes;
  std::vector<Niveau> niveaux;
  std::vector<Bande> corps;
  std::vector<Bande> total;
  std::string prefixe = "LST_";
};

struct Etat {
  std::string nom;
  bool paysage = true;
  std::string titre;  // expressions of the page heading and footer
  std::string note;
  std::string sousTitre;
  std::string pied;
  std::vector<Partie> parties;

  // Layouts known to the engine, by report name.
  static void enregistrer(const Etat& etat);
  static const Etat* trouver(const std::string& nom);
};

// Registers a layout while the library loads.
class EnregistrementEtat {
 public:
  explicit EnregistrementEtat(const Etat& etat) { Etat::enregistrer(etat); }
};

// Amount text of printed reports: "1 234,50", "-315,00".
std::string texteMontant(const Monnaie& m);

}  // namespace quarvo::host::report
