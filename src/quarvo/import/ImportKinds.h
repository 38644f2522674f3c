// The four import kinds in their fixed order (quote requests, orders, goods-received notes,
// invoices), with what the import window and the automatic import need of each: the setting
// row of "AFPARA", the file field, the staging table, the control and generation automata and
// the message numbers of a wrong extension and of a missing file.
#pragma once

#include <array>

namespace quarvo::import {

struct SorteImport {
  const char* code;        // "DF"
  const char* parametre;   // "IMPORT_03"
  const char* champ;       // "V_FICHIER_DF"
  const char* bouton;      // "V_FICHIER_DF_CHOISIR"
  const char* erreur;      // "V_ERREUR_DF"
  const char* staging;     // "IMM_PIECE_DF"
  const char* controle;    // "QUARVO-IMPORT_CONTROLER_DF"
  const char* generation;  // "QUARVO-IMPORT_GENERER_DF"
  const char* messageExtension;
  const char* messageAbsent;
};

inline constexpr std::array<SorteImport, 4> kSortesImport{{
    {"DF", "IMPORT_03", "V_FICHIER_DF", "V_FICHIER_DF_CHOISIR", "V_ERREUR_DF", "IMM_PIECE_DF",
     "QUARVO-IMPORT_CONTROLER_DF", "QUARVO-IMPORT_GENERER_DF", "103", "104"},
    {"CF", "IMPORT_04", "V_FICHIER_CF", "V_FICHIER_CF_CHOISIR", "V_ERREUR_CF", "IMM_PIECE_CF",
     "QUARVO-IMPORT_CONTROLER_CF", "QUARVO-IMPORT_GENERER_CF", "105", "106"},
    {"BF", "IMPORT_05", "V_FICHIER_BF", "V_FICHIER_BF_CHOISIR", "V_ERREUR_BF", "IMM_PIECE_BF",
     "QUARVO-IMPORT_CONTROLER_BF", "QUARVO-IMPORT_GENERER_BF", "107", "108"},
    {"FF", "IMPORT_06", "V_FICHIER_FF", "V_FICHIER_FF_CHOISIR", "V_ERREUR_FF", "IMM_PIECE_FF",
     "QUARVO-IMPORT_CONTROLER_FF", "QUARVO-IMPORT_GENERER_FF", "109", "110"},
}};

}  // namespace quarvo::import
