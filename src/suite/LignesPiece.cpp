#include "suite/LignesPiece.h"

#include "host/session/Session.h"
#include "host/table/Table.h"
#include "suite/SortesPiece.h"

namespace quarvo::suite {

using namespace host;

namespace {
constexpr const char* kParcours = "M_PARCOURS_LIGNES";
}

LignesPiece::LignesPiece(Evt* evt) : TableInterface(evt) {
  addBranch("POSDEBUT", [this](Evt* e) { posDebut(e); });
  addBranch("LECTURE_SUIVANT", [this](Evt* e) { lectureSuivant(e); });
}

void LignesPiece::duModule(Table& etat) const {
  etat.effacerCriteres();
  etat.ajouterCritere("MODULE", '=', Valeur::chaine(table()));
}

void LignesPiece::posDebut(Evt* evt) {
  Table etat(this, "", kParcours, "");
  duModule(etat);
  etat.supprimerTout();
  etat.preparer();
  etat.ecrire("MODULE", Valeur::chaine(table()));
  etat.ecrire("PIECE_IDENT", Valeur::chaine(evt->valeur(0).toChaine()));
  etat.ecrire("DERNIER", Valeur::chaine(""));
  etat.inserer();
  session().memoire("I_" + table()).clear();
  erreurMethode(0, evt);
}

void LignesPiece::lectureSuivant(Evt* evt) {
  MemoryStore& record = session().memoire("I_" + table());
  record.clear();
  Table etat(this, "", kParcours, "");
  duModule(etat);
  if (etat.lire(3) != 0) {
    erreurMethode(1, evt);
    return;
  }
  std::string dernier = etat.valeur("DERNIER").toChaine();
  Table lignes(this, nomBase(), table(), "PARCOURS");
  selectionnerLignes(lignes, etat.valeur("PIECE_IDENT").toChaine());
  while (lignes.lire(1) == 0) {
    std::string ident = lignes.valeur("IDENT").toChaine();
    if (!dernier.empty() && ident <= dernier) continue;
    record.remplacerPar(lignes.ligne());
    etat.ecrire("DERNIER", Valeur::chaine(ident));
    etat.modifier();
    erreurMethode(0, evt);
    return;
  }
  erreurMethode(1, evt);
}

}  // namespace quarvo::suite
