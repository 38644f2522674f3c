#include "suite/ChoixPieces.h"

#include <algorithm>

#include "host/session/Session.h"
#include "host/table/Table.h"

namespace quarvo::suite {

using namespace host;

namespace {
constexpr const char* kParametres = "M_CHOIX_PARAMETRES";
}

void retenirAffaire(Automate& module, const std::string& nom, Evt* evt) {
  Table parametres(&module, "", kParametres, "");
  parametres.effacerCriteres();
  parametres.ajouterCritere("MODULE", '=', Valeur::chaine(nom));
  parametres.supprimerTout();
  parametres.preparer();
  parametres.ecrire("MODULE", Valeur::chaine(nom));
  parametres.ecrire("AFFAIRE", Valeur::chaine(evt->valeur(1).toChaine()));
  parametres.inserer();
  module.erreurMethode(0, evt);
}

std::string affaireRetenue(Automate& module, const std::string& nom) {
  Table parametres(&module, "", kParametres, "");
  parametres.effacerCriteres();
  parametres.ajouterCritere("MODULE", '=', Valeur::chaine(nom));
  return parametres.lire(3) == 0 ? parametres.valeur("AFFAIRE").toChaine() : std::string();
}

Candidat candidat(Table& entete, const SortePiece& sorte) {
  Candidat c;
  c.ident = entete.valeur("IDENT").toChaine();
  c.numero = entete.valeur("NUMERO_DOC").toChaine();
  c.texte = c.numero + "  " + toDate(entete.valeur(sorte.colonneDate)).text() + "  " +
            entete.valeur("DESIG").toChaine();
  return c;
}

std::optional<std::string> choisirParmi(Automate& module, const SortePiece& sorte,
                                        const std::string& affaire,
                                        std::vector<Candidat> candidats) {
  if (candidats.empty()) return std::nullopt;
  std::stable_sort(candidats.begin(), candidats.end(), [](const Candidat& a, const Candidat& b) {
    return a.numero != b.numero ? a.numero < b.numero : a.ident < b.ident;
  });
  std::vector<std::string> items;
  items.reserve(candidats.size());
  for (const auto& c : candidats) items.push_back(c.texte);
  std::string titre = std::string(sorte.pluriel) + " de l'affaire " + affaire;
  std::optional<int> choisi = module.session().ui().choisir(titre, items);
  if (!choisi || *choisi < 1 || static_cast<size_t>(*choisi) > candidats.size()) {
    return std::nullopt;
  }
  return candidats[static_cast<size_t>(*choisi) - 1].ident;
}

}  // namespace quarvo::suite
