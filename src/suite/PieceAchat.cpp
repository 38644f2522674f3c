#include "suite/PieceAchat.h"

#include <set>

#include "host/session/Session.h"
#include "host/table/Table.h"
#include "suite/ChoixPieces.h"
#include "suite/SortesPiece.h"

namespace quarvo::suite {

using namespace host;

PieceAchat::PieceAchat(Evt* evt) : PieceGeneration(evt) {
  addBranch("AFFECTE_PARAMETRES", [this](Evt* e) { retenirAffaire(*this, table(), e); });
  addBranch("CHOISIR", [this](Evt* e) { choisir(e); });
  addBranch("DROIT_TRANSFORMATION_DOC", [this](Evt* e) { droitTransformation(e); });
}

void PieceAchat::choisir(Evt* evt) {
  Field& ident = chaine("P_IDENT");
  evt->param(0, ident, 1);
  const SortePiece* sorte = sorteDuModule(table());
  std::string affaire = affaireRetenue(*this, table());
  if (sorte == nullptr || affaire.empty()) {
    erreurMethode(1, evt);
    return;
  }
  std::vector<Candidat> candidats;
  Table entetes(this, sorte->base, sorte->module, "CHOIX");
  entetes.effacerCriteres();
  entetes.ajouterCritere("SECAN_CODE", '=', Valeur::chaine(affaire));
  entetes.ouvrir();
  while (entetes.lire(1) == 0) candidats.push_back(candidat(entetes, *sorte));

  // Pieces without a section of their own belong to the project of their lines.
  std::set<std::string> parLignes;
  Table lignes(this, sorte->base, sorte->lignes, "CHOIX");
  lignes.effacerCriteres();
  lignes.ajouterCritere("SECAN_CODE", '=', Valeur::chaine(affaire));
  lignes.ouvrir();
  while (lignes.lire(1) == 0) {
    std::string numero = lignes.valeur("NUMERO").toChaine();
    parLignes.insert(numero.substr(0, numero.find('|')));
  }
  for (const auto& piece : parLignes) {
    if (entetes.chercher(3, "IDENT", '=', Valeur::chaine(piece)) != 0) continue;
    if (!entetes.valeur("SECAN_CODE").toChaine().empty()) continue;
    candidats.push_back(candidat(entetes, *sorte));
  }

  auto choisi = choisirParmi(*this, *sorte, affaire, std::move(candidats));
  if (!choisi) {
    erreurMethode(1, evt);
    return;
  }
  ident.set(*choisi);
  erreurMethode(0, evt);
}

std::string PieceAchat::droits() {
  Field& application = chaine("P_APPLICATION");
  Table sysappli(this, nomBase(), "I_SYSAPPLI", "");
  for (const std::string& code : {table(), std::string("DOVERUVA")}) {
    EvtParamVal lecture{val(code)};
    if (session().appelerProcedure("SYSAPPLI", "LECTURE_CODE", &lecture) == 0) {
      application.assign(sysappli.valeur("IDENT"));
      break;
    }
  }
  EvtParamRef courants{ref(application)};
  if (session().appelerProcedure("SYSDROIT", "LECTURE_DROITS_COURANTS", &courants) != 0) {
    return "";
  }
  return Table(this, nomBase(), "I_SYSDROIT", "").valeur("DROITS").toChaine();
}

void PieceAchat::droitTransformation(Evt* evt) {
  Field& modes = chaine("P_MODES");
  evt->param(1, modes, 1);
  Table piece(this, "GESCOM", table(), "DROITS");
  if (evt->valeur(0).toChaine().empty() || piece.chercher(3, "IDENT", '=', evt->valeur(0)) != 0) {
    erreurMethode(1, evt);
    return;
  }
  // "COMPARE_DROIT" fails when no letter is left: the narrowed modes are the answer all the same.
  EvtParamRef compare{ref(modes), val(droits()), val("TRANSFORMATION")};
  session().appelerProcedure("SYSDROIT", "COMPARE_DROIT", &compare);
  erreurMethode(0, evt);
}

}  // namespace quarvo::suite
