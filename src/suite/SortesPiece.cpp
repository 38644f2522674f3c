#include "suite/SortesPiece.h"

namespace quarvo::suite {

using namespace host;

namespace {
constexpr const SortePiece* kSortes[] = {&kCommandes, &kReceptions, &kFactures, &kReleves};
}

const SortePiece* sorteDuModule(const std::string& module) {
  for (const SortePiece* s : kSortes) {
    if (module == s->module) return s;
  }
  return nullptr;
}

const SortePiece* sorteDuType(int64_t typePiece) {
  for (const SortePiece* s : kSortes) {
    if (s->typePiece != 0 && s->typePiece == typePiece) return s;
  }
  return nullptr;
}

void selectionnerLignes(Table& lignes, const std::string& ident) {
  lignes.effacerCriteres();
  lignes.ajouterCritere("NUMERO", '/', Valeur::chaine(ident + "|"), 'R');
  lignes.ouvrir();
}

std::string rangLigne(const std::string& numero) {
  auto bar = numero.rfind('|');
  return bar == std::string::npos ? std::string() : numero.substr(bar + 1);
}

}  // namespace quarvo::suite
