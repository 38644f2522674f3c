#include "quarvo/frame/PieceKinds.h"

namespace quarvo::frame {

const PieceKind* kindOfTable(std::string_view name) {
  for (const auto& k : kPieceKinds) {
    if (k.header == name || (!k.composant.empty() && k.composant == name)) return &k;
  }
  return nullptr;
}

const PieceKind* kindOfTypeCode(int typeCode) {
  for (const auto& k : kPieceKinds) {
    if (k.typeCode != 0 && k.typeCode == typeCode) return &k;
  }
  return nullptr;
}

std::string legendePiece(std::string_view composant, const std::string& numero,
                         std::string_view typeFacture) {
  if (composant == "GAPECOM") return "BC " + numero;
  if (composant == "GAPEBL") return "BR " + numero;
  return (typeFacture == "F" ? "F " : "A ") + numero;
}

}  // namespace quarvo::frame
