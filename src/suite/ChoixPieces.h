// What the piece modules ("GAPECOM", "GAPEBL", "GAPEFAC") and the time entries ("AFEFFO") share
// to offer a person their documents of one project: the project remembered for the session, and
// the choice list itself. The modules decide which documents belong to the project; these
// functions keep the project and ask the person.
//
// Rule: "AFFECTE_PARAMETRES" (a text, not used; a project code) remembers the code in the
// session's memory table "M_CHOIX_PARAMETRES", one row per module ("MODULE", "AFFAIRE"), until
// the module's next "AFFECTE_PARAMETRES"; it always succeeds. A choice offers the documents in
// "NUMERO_DOC" order (ties in identifier order), each as "<number>  <date>  <designation>", under
// the title "<kinds> de l'affaire <code>"; the person chooses one or none. With nothing to offer
// nobody is asked.
#pragma once

#include <optional>
#include <string>
#include <vector>

#include "host/automate/Automate.h"
#include "suite/SortesPiece.h"

namespace quarvo::suite {

// "AFFECTE_PARAMETRES" of `module`: parameter 1 becomes its remembered project.
void retenirAffaire(host::Automate& module, const std::string& nom, host::Evt* evt);
// The project remembered for module `nom`; empty when none.
std::string affaireRetenue(host::Automate& module, const std::string& nom);

// One document that may be chosen.
struct Candidat {
  std::string ident;
  std::string numero;  // "NUMERO_DOC"
  std::string texte;   // what the list shows
};
// The candidate for the current row of `entete`, a cursor on the header table of `sorte`.
Candidat candidat(host::Table& entete, const SortePiece& sorte);

// Asks the person to choose among `candidats` (sorted here) of project `affaire`; the chosen
// document's identifier, or nothing when none was chosen or there was nothing to offer.
std::optional<std::string> choisirParmi(host::Automate& module, const SortePiece& sorte,
                                        const std::string& affaire,
                                        std::vector<Candidat> candidats);

}  // namespace quarvo::suite
