#include "suite/Afmouv.h"

#include "host/session/Session.h"
#include "host/table/Table.h"

namespace quarvo::suite {

using namespace host;

Afmouv::Afmouv(Evt* evt) : Interface2(evt) {
  addBranch("LECTURE_CLE_COMPO", [this](Evt* e) { lectureCleCompo(e); });
  addBranch("GENERER_PIECE", [this](Evt* e) { genererPiece(e); });
  addBranch("MAJ_PIECE_GENEREE", [this](Evt* e) { majPieceGeneree(e); });
  addBranch("MAJ_PIECE_SUPPRIMEE", [this](Evt* e) { majPieceSupprimee(e); });
  addBranch("SUPPRIMER_PIECE", [this](Evt* e) { supprimerPiece(e); });
}

void Afmouv::selectionner(Table& t, Evt* evt, bool live) {
  t.effacerCriteres();
  t.ajouterCritere("COMPOSANT", '=', evt->valeur(0));
  t.ajouterCritere("COMPOSANT_IDENT", '=', evt->valeur(1));
  if (live) t.ajouterCritere("ETAT", '=', Valeur::chaine("G"));
  t.ouvrir();
}

void Afmouv::lectureCleCompo(Evt* evt) {
  Table moves(this, nomBase(), "AFMOUV", "MOUVEMENTS");
  MemoryStore& record = session().memoire("I_AFMOUV");
  record.clear();
  selectionner(moves, evt, true);
  if (moves.lire(1) != 0) {
    erreurMethode(1, evt);
    return;
  }
  record.remplacerPar(moves.ligne());
  erreurMethode(0, evt);
}

void Afmouv::genererPiece(Evt* evt) {
  Table moves(this, nomBase(), "AFMOUV", "MOUVEMENTS");
  selectionner(moves, evt, true);
  if (moves.lire(1) == 0) {
    erreurMethode(0, evt);
    return;
  }
  Field& ident = chaine("P_IDENT");
  EvtParamRef numbering{val("VOVOVA"), val("NUMEROS"), val("AFMOUV"), val(""), val(10), ref(ident)};
  if (session().appelerProcedure("ZUMNDOC", "ATTRIBUE_NUMERO", &numbering) != 0) {
    erreurMethode(1, evt);
    return;
  }
  moves.preparer();
  moves.ecrire("IDENT", ident.value());
  moves.ecrire("COMPOSANT", evt->valeur(0));
  moves.ecrire("COMPOSANT_IDENT", evt->valeur(1));
  moves.ecrire("CLE_COMPO",
               Valeur::chaine(evt->valeur(0).toChaine() + "|" + evt->valeur(1).toChaine()));
  moves.ecrire("ETAT", Valeur::chaine("G"));
  moves.ecrire("DATE_MAJ", Valeur::date(Date::today()));
  erreurMethode(moves.inserer(), evt);
}

void Afmouv::majPieceGeneree(Evt* evt) {
  Table moves(this, nomBase(), "AFMOUV", "MOUVEMENTS");
  selectionner(moves, evt, true);
  if (moves.lire(1) != 0) {
    erreurMethode(1, evt);
    return;
  }
  Table links(this, nomBase(), "QUARVO", "LIENS");
  links.effacerCriteres();
  links.ajouterCritere("COMPOSANT", '=', evt->valeur(0));
  links.ajouterCritere("COMPOSANT_IDENT", '=', evt->valeur(1));
  links.ouvrir();
  Monnaie amount;
  double quantity = 0;
  while (links.lire(1) == 0) {
    amount += toMonnaie(links.valeur("HT"));
    quantity += toDouble(links.valeur("QTE"));
    moves.ecrire("PIECE", links.valeur("PIECE"));
    moves.ecrire("DATE_PIECE", links.valeur("DATE_PIECE"));
    moves.ecrire("AFAFFA_IDENT", links.valeur("AFAFFA_IDENT"));
  }
  moves.ecrire("MONTANT", Valeur::monnaie(amount));
  moves.ecrire("QTE", Valeur::dbl(quantity));
  moves.ecrire("DATE_MAJ", Valeur::date(Date::today()));
  erreurMethode(moves.modifier(), evt);
}

void Afmouv::majPieceSupprimee(Evt* evt) {
  Table moves(this, nomBase(), "AFMOUV", "MOUVEMENTS");
  selectionner(moves, evt, false);
  int found = 1;
  while (moves.lire(1) == 0) {
    moves.ecrire("ETAT", Valeur::chaine("S"));
    moves.modifier();
    found = 0;
  }
  erreurMethode(found, evt);
}

void Afmouv::supprimerPiece(Evt* evt) {
  Table moves(this, nomBase(), "AFMOUV", "MOUVEMENTS");
  selectionner(moves, evt, false);
  int found = 1;
  while (moves.lire(1) == 0) {
    moves.supprimer('N');
    found = 0;
  }
  erreurMethode(found, evt);
}

}  // namespace quarvo::suite
