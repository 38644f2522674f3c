// The settling services of the purchasing side: "GCPFOUR" (suppliers), "GCPSTOCK" (stock),
// "GCPX" (piece lines) and the lot module "GAPLOT", as the settling of a piece calls them.
//
// Rule, with the piece type codes -1 quote request ("GAPEDEV"/"GAPLDEV"), -2 order
// ("GAPECOM"/"GAPLCOM"), -3 goods-received note ("GAPEBL"/"GAPLBL"), -4 invoice:
// - "GCPFOUR" (besides the generic reads): "DEBUT_SOLDE" (type, supplier) fails when the
//   supplier does not exist. "SOLDE_PIECE" (type, piece, HT, TTC) marks the header settled:
//   "SOLDEE" = 1 and the settled amounts "MTNT_HT"/"MTNT_TTC" = the two amounts, and renews its
//   update stamp ("DATE_MAJ", "HEURE_MAJ"); it fails when the piece does not exist. "FIN_SOLDE"
//   succeeds.
// - "GCPSTOCK": "DEBUT_SOLDE" (type) remembers the type for the session; "SOLDE_LIGNE"
//   (article, depot, quantity) lowers the expected quantity "QTE_ATTENDUE" of the article in
//   that depot by the quantity (never below 0) when an order is being settled; other kinds and
//   articles without a stock row change nothing. "FIN_SOLDE" forgets the type.
// - "GCPX": "SOLDE_LIGNE" (type, piece, line, QTE, QTT) sets the line's "QTE_SOLDEE" to
//   QTE - QTT; "SOLDE_PIECE" (type, piece) sets the header's "QTNT" (quantity still expected)
//   to 0. Both fail when the row does not exist. "DEBUT_SOLDE" and "FIN_SOLDE" succeed.
// - "GAPLOT" (lots of order and receipt lines): "DEBUT_TRANSACTION" (empty, type, piece, line)
//   opens a walk over the lots of that line in "IDENT" order; "POSDEBUT" goes back to its
//   start; "LIRESUIVANT" reads the next lot into "I_GAPLOT" and fails after the last;
//   "SOLDER_FICHE" sets the lot just read to "SOLDE" = 1; "SUPPRIMER_FICHE" deletes it;
//   "FIN_TRANSACTION" closes the walk. The walk is kept in the session's memory table
//   "M_GAPLOT_TRANSACTION", so it survives from one call to the next.
#pragma once

#include "suite/TableInterface.h"

namespace quarvo::suite {

// Header and line tables of a piece type code ("" when the code is unknown).
std::string tableEntete(int64_t typePiece);
std::string tableLignes(int64_t typePiece);

class Gcpfour : public TableInterface {
 public:
  explicit Gcpfour(host::Evt* evt);

 private:
  void debutSolde(host::Evt* evt);
  void soldePiece(host::Evt* evt);
};

class Gcpstock : public host::Interface2 {
 public:
  bool reutilisable() const override { return true; }  // keeps nothing between calls
  explicit Gcpstock(host::Evt* evt);

 private:
  void soldeLigne(host::Evt* evt);
};

class Gcpx : public host::Interface2 {
 public:
  bool reutilisable() const override { return true; }  // keeps nothing between calls
  explicit Gcpx(host::Evt* evt);

 private:
  void soldeLigne(host::Evt* evt);
  void soldePiece(host::Evt* evt);
};

class Gaplot : public TableInterface {
 public:
  explicit Gaplot(host::Evt* evt);

 private:
  void debutTransaction(host::Evt* evt);
  void posDebut(host::Evt* evt);
  void lireSuivant(host::Evt* evt);
  void modifierFiche(host::Evt* evt, bool supprimer);
  void finTransaction(host::Evt* evt);
};

}  // namespace quarvo::suite
