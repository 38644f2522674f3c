#include "quarvo/imputation/QUARVOImputer_pieces.h"

#include <set>
#include <string>
#include <vector>

#include "host/session/Session.h"
#include "host/table/Database.h"
#include "quarvo/frame/Appels.h"
#include "quarvo/frame/Keys.h"

namespace quarvo {

using namespace host;
using frame::appeler;

QUARVOImputer_pieces::QUARVOImputer_pieces(Evt* evt)
    : Traitmnt(evt),
      vIdent_(chaine("V_IDENT")),
      eappr_(this, "VOVOVA", "M_EAPPR", ""),
      lappr_(this, "VOVOVA", "M_LAPPR", ""),
      vappr_(this, "VOVOVA", "M_VAPPR", ""),
      iAflbud_(this, "VOVOVA", "I_AFLBUD", ""),
      iAfaffa_(this, "VOVOVA", "I_AFAFFA", ""),
      quarvo_(this, "VOVOVA", "QUARVO", "") {
  nomBase("VOVOVA");
  nomTable("QUARVO");
  addBranch("FAIRE", [this](Evt* e) { faire(e); });
  addBranch("SUPPRESSION_MAJ_LIENS", [this](Evt* e) { suppression_maj_liens(e); });
  addBranch("MAJ_QUARVO", [this](Evt* e) { maj_quarvo(e); });
  addBranch("MAJ_LIENS", [this](Evt* e) { maj_liens(e); });
}

namespace {

// A piece's version: the day and time of its last change.
std::string version(Table& t) {
  return toDate(t.valeur("DATE_MAJ")).text() + t.valeur("HEURE_MAJ").toChaine();
}

}  // namespace

void QUARVOImputer_pieces::faire(Evt* evt) {
  eappr_.effacerCriteres();
  eappr_.ajouterCritere("IMPUTATION", '=', Valeur::chaine("O"));
  eappr_.ouvrir();
  // Pieces are committed by groups, each piece a savepoint of its group: a piece is still
  // written whole or not at all, and the pages every piece touches (budget lines, counters,
  // indexes) are written once per group. What a piece's record says of it is written once its
  // group is in the database, so that a run cut short never counts a piece it lost.
  struct Ecrite {
    RowId piece;
    std::string resultat;
    int64_t liens;
    Monnaie ht;
  };
  std::vector<Ecrite> enAttente;
  auto noter = [this, &enAttente] {
    for (const auto& e : enAttente) {
      eappr_.aller(e.piece);
      eappr_.ecrire("ECRITURE", Valeur::chaine(e.resultat));
      eappr_.ecrire("LIENS_CREES", Valeur::entier(e.liens));
      eappr_.ecrire("HT_LIE", Valeur::monnaie(e.ht));
      eappr_.modifier();
    }
    enAttente.clear();
  };
  TransactionsGroupees groupe(session().db());
  while (eappr_.lire(1) == 0) {
    liensCrees_ = 0;
    htLie_ = Monnaie();
    RowId courante = eappr_.courantId();
    {
      // Its savepoint is a write transaction from the group's start, so one writer at a time
      // decides what the piece still needs.
      Transaction piece(session().db());
      std::string resultat = ecrirePiece(evt);
      piece.commit();
      enAttente.push_back({courante, resultat, liensCrees_, htLie_});
    }
    eappr_.aller(courante);
    if (groupe.uniteTerminee()) noter();
  }
  groupe.terminer();
  noter();
  erreurMethode(0, evt);
  sortir(nullptr, 0);
}

std::string QUARVOImputer_pieces::ecrirePiece(Evt* evt) {
  // Links of the piece written since the pointing (by another job) are never added to: the
  // piece is left as it is. Links of an earlier version of the piece go before the new ones.
  Table dejaLies(this, "VOVOVA", "QUARVO", "DEJA_LIES");
  dejaLies.effacerCriteres();
  dejaLies.ajouterCritere("COMPOSANT", '=', eappr_.valeur("COMPOSANT"));
  dejaLies.ajouterCritere("COMPOSANT_IDENT", '=', eappr_.valeur("COMPOSANT_IDENT"));
  if (dejaLies.lire(3) == 0) {
    if (version(dejaLies) == version(eappr_)) return "DEJA_LIEE";
    EvtParamVal cancel{eappr_.valeur("COMPOSANT"), eappr_.valeur("COMPOSANT_IDENT")};
    appelerModule("", "QUARVO", "QUARVO-ANNULER1", &cancel);
  }
  // From here the piece has no link but those this loop writes: a budget line's figures need
  // the piece's links withdrawn first only once the loop wrote one there (two lines of the
  // piece on one budget line); before that there is nothing to withdraw, and the validation
  // recomputes the line and its results all the same.
  std::set<std::string> lignesLiees;
  lappr_.chercher(3, "NUMERO", '/', Valeur::chaine(eappr_.valeur("IDENT").toChaine() + "|"));
  lappr_.ouvrir();
  while (lappr_.lire(1) == 0) {
    std::string key =
        lappr_.valeur("COMPOSANT").toChaine() + "|" + lappr_.valeur("COMPOSANT_IDENT").toChaine();
    vappr_.chercher(3, "IDENT", '=', Valeur::chaine(key));
    vappr_.ouvrir();
    while (vappr_.lire(1) == 0) {
      if (toDouble(vappr_.valeur("QTE")) == 0) continue;
      if (appeler(*this, "AFAFFA", "LECTURE", {vappr_.valeur("AFAFFA_IDENT")}) != 0) continue;
      if (appeler(*this, "AFLBUD", "LECTURE", {vappr_.valeur("AFLBUD_IDENT")}) != 0) continue;
      if (appeler(*this, "AFPRES", "LECTURE", {iAflbud_.valeur("AFPRES_IDENT")}) != 0) continue;
      if (!lignesLiees.insert(iAflbud_.valeur("IDENT").toChaine()).second) {
        appelerProcedure("", "", "", "SUPPRESSION_MAJ_LIENS", evt, 0);
      }
      appelerProcedure("", "", "", "MAJ_QUARVO", evt, 0);
      appelerProcedure("", "", "", "MAJ_LIENS", evt, 0);
    }
  }
  return "ECRITE";
}

// The withdraw and recompute around a write concern only the piece being written: the other
// links of the budget line would be withdrawn and added back unchanged.
void QUARVOImputer_pieces::suppression_maj_liens(Evt*) {
  appeler(*this, "QUARVO", "SUPPRESSION_MAJ",
          {iAflbud_.valeur("IDENT"), eappr_.valeur("COMPOSANT"), eappr_.valeur("COMPOSANT_IDENT")});
}

void QUARVOImputer_pieces::maj_liens(Evt*) {
  appeler(*this, "QUARVO", "VALIDATION_MAJ",
          {iAflbud_.valeur("IDENT"), eappr_.valeur("COMPOSANT"), eappr_.valeur("COMPOSANT_IDENT")});
}

void QUARVOImputer_pieces::maj_quarvo(Evt* evt) {
  erreurMethode(0, evt);
  std::string key =
      frame::cleCompo(vappr_.valeur("AFLBUD_IDENT").toChaine(),
                      eappr_.valeur("COMPOSANT").toChaine(), eappr_.valeur("PIECE").toChaine());
  if (quarvo_.chercher(3, "CLE_COMPO", '=', Valeur::chaine(key)) != 0) {
    quarvo_.preparer();
    frame::numeroter(*this, "VOVOVA", "QUARVO", vIdent_);
    quarvo_.ecrire("IDENT", vIdent_.value());
    quarvo_.ecrire("AFEBUD_IDENT", vappr_.valeur("AFEBUD_IDENT"));
    quarvo_.ecrire("AFAFFA_IDENT", vappr_.valeur("AFAFFA_IDENT"));
    quarvo_.ecrire("AFLBUD_IDENT", vappr_.valeur("AFLBUD_IDENT"));
    quarvo_.ecrire("AFAFFA_CODE", iAfaffa_.valeur("CODE"));
    for (const char* column :
         {"COMPOSANT", "COMPOSANT_IDENT", "PIECE", "DATE_PIECE", "DATE_MAJ", "HEURE_MAJ"}) {
      quarvo_.ecrire(column, eappr_.valeur(column));
    }
    // The database also derives the keys from the columns; written here all the same, so the key
    // holds on any database.
    quarvo_.ecrire("CLE_COMPO", Valeur::chaine(key));
    quarvo_.inserer();
    ++liensCrees_;
  }
  htLie_ += toMonnaie(vappr_.valeur("HT"));
  quarvo_.ecrire("QTE",
                 Valeur::dbl(toDouble(quarvo_.valeur("QTE")) + toDouble(vappr_.valeur("QTE"))));
  quarvo_.ecrire("HT",
                 Valeur::monnaie(toMonnaie(quarvo_.valeur("HT")) + toMonnaie(vappr_.valeur("HT"))));
  quarvo_.ecrire("QTT",
                 Valeur::dbl(toDouble(quarvo_.valeur("QTT")) + toDouble(vappr_.valeur("QTT"))));
  quarvo_.modifier();
}

}  // namespace quarvo
