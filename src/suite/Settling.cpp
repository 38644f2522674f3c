#include "suite/Settling.h"

#include <algorithm>
#include <memory>

#include "host/session/Session.h"
#include "host/table/Table.h"

namespace quarvo::suite {

using namespace host;

std::string tableEntete(int64_t typePiece) {
  switch (typePiece) {
    case -1:
      return "GAPEDEV";
    case -2:
      return "GAPECOM";
    case -3:
      return "GAPEBL";
    case -4:
      return "GAPEFAC";
    default:
      return "";
  }
}

std::string tableLignes(int64_t typePiece) {
  std::string header = tableEntete(typePiece);
  return header.empty() ? header : "GAPL" + header.substr(4);
}

namespace {

// The row `IDENT` = `ident` of `table` in a fresh cursor; false when there is none.
bool trouver(Table& t, const Valeur& ident) {
  return t.chercher(3, "IDENT", '=', ident) == 0;
}

// A cursor of `owner` on the piece header or line `ident` to settle, in `table` (empty for an
// unknown kind of piece); null when there is no such row.
std::unique_ptr<Table> aSolder(Automate& owner, const std::string& table, const Valeur& ident) {
  if (table.empty()) return nullptr;
  auto row = std::make_unique<Table>(&owner, "GESCOM", table, "SOLDE");
  if (!trouver(*row, ident)) return nullptr;
  return row;
}

}  // namespace

// ---------------------------------------------------------------------------------------------
// GCPFOUR

Gcpfour::Gcpfour(Evt* evt) : TableInterface(evt) {
  addBranch("DEBUT_SOLDE", [this](Evt* e) { debutSolde(e); });
  addBranch("SOLDE_PIECE", [this](Evt* e) { soldePiece(e); });
  addBranch("FIN_SOLDE", [this](Evt* e) { erreurMethode(0, e); });
}

void Gcpfour::debutSolde(Evt* evt) {
  Table four(this, "GESCOM", "GCPFOUR", "SOLDE");
  erreurMethode(trouver(four, evt->valeur(1)) ? 0 : 1, evt);
}

void Gcpfour::soldePiece(Evt* evt) {
  auto piece = aSolder(*this, tableEntete(toEntier(evt->valeur(0))), evt->valeur(1));
  if (!piece) {
    erreurMethode(1, evt);
    return;
  }
  piece->ecrire("SOLDEE", Valeur::entier(1));
  piece->ecrire("MTNT_HT", Valeur::monnaie(toMonnaie(evt->valeur(2))));
  piece->ecrire("MTNT_TTC", Valeur::monnaie(toMonnaie(evt->valeur(3))));
  horodater(*piece);  // a settled piece has changed: its links no longer say what it is
  erreurMethode(piece->modifier(), evt);
}

// ---------------------------------------------------------------------------------------------
// GCPSTOCK

namespace {
constexpr const char* kSoldeStock = "M_GCPSTOCK_SOLDE";
}

Gcpstock::Gcpstock(Evt* evt) : Interface2(evt) {
  addBranch("DEBUT_SOLDE", [this](Evt* e) {
    Table etat(this, "", kSoldeStock, "");
    etat.effacerCriteres();
    etat.supprimerTout();
    etat.preparer();
    etat.ecrire("TYPE_PIECE", Valeur::entier(toEntier(e->valeur(0))));
    etat.inserer();
    erreurMethode(0, e);
  });
  addBranch("SOLDE_LIGNE", [this](Evt* e) { soldeLigne(e); });
  addBranch("FIN_SOLDE", [this](Evt* e) {
    Table etat(this, "", kSoldeStock, "");
    etat.effacerCriteres();
    etat.supprimerTout();
    erreurMethode(0, e);
  });
}

void Gcpstock::soldeLigne(Evt* evt) {
  Table etat(this, "", kSoldeStock, "");
  etat.effacerCriteres();
  bool commande = etat.lire(3) == 0 && toEntier(etat.valeur("TYPE_PIECE")) == -2;
  if (!commande) {
    erreurMethode(0, evt);
    return;
  }
  Table stock(this, "GESCOM", "GCPSTOCK", "SOLDE");
  stock.effacerCriteres();
  stock.ajouterCritere("GCPARTIC_IDENT", '=', evt->valeur(0));
  stock.ajouterCritere("GCPDEPOT_IDENT", '=', evt->valeur(1));
  if (stock.lire(3) != 0) {
    erreurMethode(0, evt);
    return;
  }
  double attendue =
      std::max(0.0, toDouble(stock.valeur("QTE_ATTENDUE")) - toDouble(evt->valeur(2)));
  stock.ecrire("QTE_ATTENDUE", Valeur::dbl(attendue));
  erreurMethode(stock.modifier(), evt);
}

// ---------------------------------------------------------------------------------------------
// GCPX

Gcpx::Gcpx(Evt* evt) : Interface2(evt) {
  addBranch("DEBUT_SOLDE", [this](Evt* e) { erreurMethode(0, e); });
  addBranch("SOLDE_LIGNE", [this](Evt* e) { soldeLigne(e); });
  addBranch("SOLDE_PIECE", [this](Evt* e) { soldePiece(e); });
  addBranch("FIN_SOLDE", [this](Evt* e) { erreurMethode(0, e); });
}

void Gcpx::soldeLigne(Evt* evt) {
  auto line = aSolder(*this, tableLignes(toEntier(evt->valeur(0))), evt->valeur(2));
  if (!line) {
    erreurMethode(1, evt);
    return;
  }
  line->ecrire("QTE_SOLDEE", Valeur::dbl(toDouble(evt->valeur(3)) - toDouble(evt->valeur(4))));
  erreurMethode(line->modifier(), evt);
}

void Gcpx::soldePiece(Evt* evt) {
  auto piece = aSolder(*this, tableEntete(toEntier(evt->valeur(0))), evt->valeur(1));
  if (!piece) {
    erreurMethode(1, evt);
    return;
  }
  piece->ecrire("QTNT", Valeur::dbl(0.0));
  erreurMethode(piece->modifier(), evt);
}

// ---------------------------------------------------------------------------------------------
// GAPLOT

namespace {
constexpr const char* kTransactionLots = "M_GAPLOT_TRANSACTION";
}

Gaplot::Gaplot(Evt* evt) : TableInterface(evt) {
  addBranch("DEBUT_TRANSACTION", [this](Evt* e) { debutTransaction(e); });
  addBranch("POSDEBUT", [this](Evt* e) { posDebut(e); });
  addBranch("LIRESUIVANT", [this](Evt* e) { lireSuivant(e); });
  addBranch("SOLDER_FICHE", [this](Evt* e) { modifierFiche(e, false); });
  addBranch("SUPPRIMER_FICHE", [this](Evt* e) { modifierFiche(e, true); });
  addBranch("FIN_TRANSACTION", [this](Evt* e) { finTransaction(e); });
}

void Gaplot::debutTransaction(Evt* evt) {
  Table etat(this, "", kTransactionLots, "");
  etat.effacerCriteres();
  etat.supprimerTout();
  etat.preparer();
  etat.ecrire("TYPE_PIECE", Valeur::entier(toEntier(evt->valeur(1))));
  etat.ecrire("PIECE_IDENT", Valeur::chaine(evt->valeur(2).toChaine()));
  etat.ecrire("LIGNE_IDENT", Valeur::chaine(evt->valeur(3).toChaine()));
  etat.ecrire("DERNIER", Valeur::chaine(""));
  etat.inserer();
  session().memoire("I_GAPLOT").clear();
  erreurMethode(0, evt);
}

void Gaplot::posDebut(Evt* evt) {
  Table etat(this, "", kTransactionLots, "");
  etat.effacerCriteres();
  if (etat.lire(3) != 0) {
    erreurMethode(1, evt);
    return;
  }
  etat.ecrire("DERNIER", Valeur::chaine(""));
  etat.modifier();
  erreurMethode(0, evt);
}

void Gaplot::lireSuivant(Evt* evt) {
  Table etat(this, "", kTransactionLots, "");
  etat.effacerCriteres();
  MemoryStore& record = session().memoire("I_GAPLOT");
  record.clear();
  if (etat.lire(3) != 0) {
    erreurMethode(1, evt);
    return;
  }
  Table lots(this, "GESCOM", "GAPLOT", "TRANSACTION");
  lots.effacerCriteres();
  lots.ajouterCritere("TYPE_PIECE", '=', etat.valeur("TYPE_PIECE"));
  lots.ajouterCritere("PIECE_IDENT", '=', etat.valeur("PIECE_IDENT"));
  lots.ajouterCritere("LIGNE_IDENT", '=', etat.valeur("LIGNE_IDENT"));
  std::string dernier = etat.valeur("DERNIER").toChaine();
  lots.ouvrir();
  while (lots.lire(1) == 0) {
    std::string ident = lots.valeur("IDENT").toChaine();
    if (!dernier.empty() && ident <= dernier) continue;
    record.remplacerPar(lots.ligne());
    etat.ecrire("DERNIER", Valeur::chaine(ident));
    etat.modifier();
    erreurMethode(0, evt);
    return;
  }
  erreurMethode(1, evt);
}

void Gaplot::modifierFiche(Evt* evt, bool supprimer) {
  Table record(this, "GESCOM", "I_GAPLOT", "");
  Valeur ident = record.valeur("IDENT");
  Table lot(this, "GESCOM", "GAPLOT", "FICHE");
  if (ident.toChaine().empty() || !trouver(lot, ident)) {
    erreurMethode(1, evt);
    return;
  }
  if (supprimer) {
    erreurMethode(lot.supprimer('N'), evt);
    return;
  }
  lot.ecrire("SOLDE", Valeur::entier(1));
  erreurMethode(lot.modifier(), evt);
}

void Gaplot::finTransaction(Evt* evt) {
  Table etat(this, "", kTransactionLots, "");
  etat.effacerCriteres();
  etat.supprimerTout();
  erreurMethode(0, evt);
}

}  // namespace quarvo::suite
