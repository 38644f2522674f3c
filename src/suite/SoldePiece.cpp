#include "suite/SoldePiece.h"

#include "host/session/Session.h"
#include "host/table/Database.h"
#include "host/table/Table.h"

namespace quarvo::suite {

using namespace host;

SoldePiece::SoldePiece(Evt* evt, const SortePiece& sorte)
    : Traitmnt(evt), sorte_(sorte), ident_(chaine("P_IDENT")) {
  lierParametres(evt, {{&ident_, 0}});
  nomBase(sorte_.base);
  nomTable(sorte_.module);
  addBranch("FAIRE", [this](Evt* e) { faire(e); });
}

bool SoldePiece::service(const char* module, const char* label, std::vector<Arg> args) {
  EvtParamVal evt(std::move(args));
  appelerProcedure("*", module, "INTERFACE", label, &evt, -1);
  return erreurMethode() == 0;
}

void SoldePiece::faire(Evt* evt) {
  erreurMethode(solder() ? 0 : 1, evt);
}

bool SoldePiece::solder() {
  Transaction tx(session().db());
  Table entete(this, sorte_.base, sorte_.module, "SOLDE");
  entete.verrouiller('E');
  if (ident_.text().empty() || entete.chercher(3, "IDENT", '=', ident_.value()) != 0) {
    return false;
  }
  Valeur type = Valeur::entier(sorte_.typePiece);
  Valeur ident = entete.valeur("IDENT");
  if (!service("GCPFOUR", "DEBUT_SOLDE", {type, entete.valeur("GCPFOUR_IDENT")}) ||
      !service("GCPX", "DEBUT_SOLDE", {type, ident})) {
    return false;
  }
  Table lignes(this, sorte_.base, sorte_.lignes, "SOLDE");
  selectionnerLignes(lignes, ident.toChaine());
  while (lignes.lire(1) == 0) {
    if (!service(
            "GCPX", "SOLDE_LIGNE",
            {type, ident, lignes.valeur("IDENT"), lignes.valeur("QTE"), lignes.valeur("QTT")})) {
      return false;
    }
  }
  if (!service("GCPX", "SOLDE_PIECE", {type, ident}) ||
      !service("GCPFOUR", "SOLDE_PIECE",
               {type, ident, entete.valeur("MTNT_HT"), entete.valeur("MTNT_TTC")}) ||
      !service("GCPX", "FIN_SOLDE", {type, ident}) ||
      !service("GCPFOUR", "FIN_SOLDE", {type, ident})) {
    return false;
  }
  tx.commit();
  return true;
}

}  // namespace quarvo::suite
