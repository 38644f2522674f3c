// The purchasing piece kinds: their tables, the component code they are linked under, their
// type code in the chaining table and their group on the link document. One table, read by
// every automaton that needs to tell kinds apart.
#pragma once

#include <array>
#include <string>
#include <string_view>

namespace quarvo::frame {

struct PieceKind {
  std::string_view code;       // "DF", "CF", "BF", "FF", or "" for time entries
  std::string_view header;     // "GAPECOM"
  std::string_view lines;      // "GAPLCOM"
  std::string_view composant;  // the component in the link table ("" when never linked)
  int typeCode;                // type code in "CHAINAGE" (0 when not used)
  std::string_view group;      // group on the link document ("" when none)
};

inline constexpr std::array<PieceKind, 5> kPieceKinds{{
    {"DF", "GAPEDEV", "GAPLDEV", "", -1, ""},
    {"CF", "GAPECOM", "GAPLCOM", "GAPECOM", -2, "P1"},
    {"BF", "GAPEBL", "GAPLBL", "GAPEBL", -3, "P2"},
    {"FF", "GAPEFAC", "GAPLFAC", "GAPEFAC", -4, "P3"},
    {"", "AFEFFO", "AFLFFO", "AFEFFO", 0, "P3"},
}};

// What differs between the kinds a selection walks (orders, goods-received notes, invoices):
// the letter that selects them, their tables, the waiting box's title and the caption of a piece
// in it. The pointing and the cancellation selection walk the same three.
struct SorteSelection {
  const char* lettre;   // "C", "B", "F"
  const char* entete;   // "GAPECOM"
  const char* lignes;   // "GAPLCOM"
  const char* titre;    // "Traitement de la table GAPECOM"
  const char* libelle;  // "No commande : "
};

inline constexpr SorteSelection kCommandesSelection{
    "C", "GAPECOM", "GAPLCOM", "Traitement de la table GAPECOM", "No commande : "};
inline constexpr SorteSelection kReceptionsSelection{
    "B", "GAPEBL", "GAPLBL", "Traitement de la table GAPEBL", "No bon de réception : "};
inline constexpr SorteSelection kFacturesSelection{
    "F", "GAPEFAC", "GAPLFAC", "Traitement de la table GAPEFAC", "No facture : "};

// The caption of a piece in a selection's list: "BC " + number for an order, "BR " for a
// goods-received note, "F " for an invoice whose "TYPE" is "F" and "A " for any other invoice.
std::string legendePiece(std::string_view composant, const std::string& numero,
                         std::string_view typeFacture);

// The kind whose header table or component is `name`; null when none.
const PieceKind* kindOfTable(std::string_view name);
const PieceKind* kindOfTypeCode(int typeCode);

}  // namespace quarvo::frame
