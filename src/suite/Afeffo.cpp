#include "suite/Afeffo.h"

#include <set>

#include "host/table/Table.h"
#include "suite/ChoixPieces.h"
#include "suite/SortesPiece.h"

namespace quarvo::suite {

using namespace host;

Afeffo::Afeffo(Evt* evt) : TableInterface(evt) {
  addBranch("AFFECTE_PARAMETRES", [this](Evt* e) { retenirAffaire(*this, table(), e); });
  addBranch("CHOIX", [this](Evt* e) { choix(e); });
}

void Afeffo::choix(Evt* evt) {
  Field& ident = chaine("P_IDENT");
  evt->param(0, ident, 1);
  std::string affaire = affaireRetenue(*this, table());
  Table projet(this, nomBase(), "AFAFFA", "CHOIX");
  if (affaire.empty() || projet.chercher(3, "CODE", '=', Valeur::chaine(affaire)) != 0) {
    erreurMethode(1, evt);
    return;
  }
  std::set<std::string> releves;
  Table lignes(this, nomBase(), kReleves.lignes, "CHOIX");
  lignes.effacerCriteres();
  lignes.ajouterCritere("AFAFFA_IDENT", '=', projet.valeur("IDENT"));
  lignes.ouvrir();
  while (lignes.lire(1) == 0) {
    std::string numero = lignes.valeur("NUMERO").toChaine();
    releves.insert(numero.substr(0, numero.find('|')));
  }
  std::vector<Candidat> candidats;
  Table entetes(this, nomBase(), kReleves.module, "CHOIX");
  for (const auto& releve : releves) {
    if (entetes.chercher(3, "IDENT", '=', Valeur::chaine(releve)) == 0) {
      candidats.push_back(candidat(entetes, kReleves));
    }
  }
  auto choisi = choisirParmi(*this, kReleves, affaire, std::move(candidats));
  if (!choisi) {
    erreurMethode(1, evt);
    return;
  }
  ident.set(*choisi);
  erreurMethode(0, evt);
}

}  // namespace quarvo::suite
