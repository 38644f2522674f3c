// The kinds of document the piece automata serve, as one table of differences: supplier orders
// ("GAPECOM"), goods-received notes ("GAPEBL"), supplier invoices ("GAPEFAC") and time entries
// ("AFEFFO"). The view ("<MODULE>-GESTION"), the transformation ("<MODULE>-TRF"), the settling
// ("<MODULE>-SOLDER"), the choice lists and the line walks are each one implementation that
// reads what sets the kinds apart from here; nothing here is written to.
//
// Rule: a kind's header table is its module's name and its lines' table is `lignes`, a line's
// "NUMERO" being its header's "IDENT" | rank. `typePiece` is the kind's type code in "CHAINAGE"
// (-2 order, -3 goods-received note, -4 invoice; 0 for time entries). A transformation of a piece
// makes one of the kinds listed in its `cibles` (an order becomes a goods-received note or an
// invoice, a goods-received note an invoice); document numbers are `prefixe`, the year's last two
// digits and six digits ("BR26000003").
#pragma once

#include <span>
#include <string>

#include "host/event/Evt.h"
#include "host/table/Table.h"
#include "host/value/Valeur.h"

namespace quarvo::suite {

// A field of a document's view, filled from its header.
struct ChampVue {
  const char* champ;             // the field, of the automaton and of its screen
  host::Kind kind;               // the field's kind
  const char* colonne;           // the header's column, or the lines' column to add up
  const char* codeDe = nullptr;  // a table: the field shows that row's "CODE" for the identifier
  bool total = false;            // the sum of the lines' `colonne`
};

// A column of the view's list of lines.
struct ColonneVue {
  const char* nom;               // the list's column
  const char* colonne;           // the line's column; "NUMERO" shows the line's rank
  const char* codeDe = nullptr;  // as in ChampVue
};

struct SortePiece {
  const char* module;       // header table and module name ("GAPECOM")
  const char* lignes;       // line table ("GAPLCOM")
  const char* base;         // "GESCOM" or "VOVOVA"
  int typePiece;            // type code in "CHAINAGE"; 0 when the kind is never chained
  const char* prefixe;      // document numbers; empty when the kind is not generated here
  const char* colonneDate;  // the document's date
  const char* libelle;      // one document, in the user's words
  const char* pluriel;      // several, for the titles of choice lists
  const char* ecran;        // the screen of its view
  std::span<const ChampVue> champs;
  std::span<const ColonneVue> colonnes;
  std::span<const int> cibles;  // kinds a transformation makes from it
};

// clang-format off
inline constexpr ChampVue kChampsAchat[] = {
    {.champ = "NUMERO_DOC", .kind = host::Kind::Chaine, .colonne = "NUMERO_DOC"},
    {.champ = "DESIG", .kind = host::Kind::Chaine, .colonne = "DESIG"},
    {.champ = "DATE_CREATION", .kind = host::Kind::Date, .colonne = "DATE_CREATION"},
    {.champ = "FOURNISSEUR", .kind = host::Kind::Chaine, .colonne = "GCPFOUR_IDENT",
     .codeDe = "GCPFOUR"},
    {.champ = "VALIDEE", .kind = host::Kind::Entier, .colonne = "VALIDEE"},
    {.champ = "HT", .kind = host::Kind::Monnaie, .colonne = "HT"},
    {.champ = "QTNT", .kind = host::Kind::Double, .colonne = "QTNT"}};
inline constexpr ColonneVue kColonnesAchat[] = {
    {.nom = "L_LIGNE", .colonne = "NUMERO"},
    {.nom = "L_ARTICLE", .colonne = "GCPARTIC_CODE"},
    {.nom = "L_DESIG", .colonne = "DESIG"},
    {.nom = "L_QTE", .colonne = "QTE"},
    {.nom = "L_PUHT", .colonne = "PUHT"},
    {.nom = "L_HT", .colonne = "HT"}};

inline constexpr ChampVue kChampsTemps[] = {
    {.champ = "NUMERO_DOC", .kind = host::Kind::Chaine, .colonne = "NUMERO_DOC"},
    {.champ = "DESIG", .kind = host::Kind::Chaine, .colonne = "DESIG"},
    {.champ = "DATE_PIECE", .kind = host::Kind::Date, .colonne = "DATE_PIECE"},
    {.champ = "RESSOURCE", .kind = host::Kind::Chaine, .colonne = "AFFOUR_IDENT",
     .codeDe = "AFFOUR"},
    {.champ = "VALIDEE", .kind = host::Kind::Entier, .colonne = "VALIDEE"},
    {.champ = "QTE", .kind = host::Kind::Double, .colonne = "QTE", .total = true},
    {.champ = "HT", .kind = host::Kind::Monnaie, .colonne = "HT", .total = true}};
inline constexpr ColonneVue kColonnesTemps[] = {
    {.nom = "L_LIGNE", .colonne = "NUMERO"},
    {.nom = "L_DESIG", .colonne = "DESIG"},
    {.nom = "L_AFFAIRE", .colonne = "AFAFFA_IDENT", .codeDe = "AFAFFA"},
    {.nom = "L_PRESTATION", .colonne = "AFPRES_IDENT", .codeDe = "AFPRES"},
    {.nom = "L_QTE", .colonne = "QTE"},
    {.nom = "L_PUHT", .colonne = "PUHT"},
    {.nom = "L_HT", .colonne = "HT"}};

inline constexpr int kCiblesCommande[] = {-3, -4};
inline constexpr int kCiblesReception[] = {-4};

inline constexpr SortePiece kCommandes{
    .module = "GAPECOM", .lignes = "GAPLCOM", .base = "GESCOM", .typePiece = -2,
    .prefixe = "CF", .colonneDate = "DATE_CREATION",
    .libelle = "Commande fournisseur", .pluriel = "Commandes fournisseur", .ecran = "PIECE",
    .champs = kChampsAchat, .colonnes = kColonnesAchat, .cibles = kCiblesCommande};
inline constexpr SortePiece kReceptions{
    .module = "GAPEBL", .lignes = "GAPLBL", .base = "GESCOM", .typePiece = -3,
    .prefixe = "BR", .colonneDate = "DATE_CREATION",
    .libelle = "Bon de réception", .pluriel = "Bons de réception", .ecran = "PIECE",
    .champs = kChampsAchat, .colonnes = kColonnesAchat, .cibles = kCiblesReception};
inline constexpr SortePiece kFactures{
    .module = "GAPEFAC", .lignes = "GAPLFAC", .base = "GESCOM", .typePiece = -4,
    .prefixe = "FF", .colonneDate = "DATE_CREATION",
    .libelle = "Facture fournisseur", .pluriel = "Factures fournisseur", .ecran = "PIECE",
    .champs = kChampsAchat, .colonnes = kColonnesAchat, .cibles = {}};
inline constexpr SortePiece kReleves{
    .module = "AFEFFO", .lignes = "AFLFFO", .base = "VOVOVA", .typePiece = 0,
    .prefixe = "", .colonneDate = "DATE_PIECE",
    .libelle = "Relevé d'heures", .pluriel = "Relevés d'heures", .ecran = "AFEFFO",
    .champs = kChampsTemps, .colonnes = kColonnesTemps, .cibles = {}};
// clang-format on

// The kind whose module (header table) is `module`, or whose type code is `typePiece`; null
// when there is none.
const SortePiece* sorteDuModule(const std::string& module);
const SortePiece* sorteDuType(int64_t typePiece);

// Selects the lines of piece `ident` on `lignes` (a cursor on the kind's line table), in key
// order.
void selectionnerLignes(host::Table& lignes, const std::string& ident);
// A line's rank: what follows "|" in its "NUMERO".
std::string rangLigne(const std::string& numero);

// An automaton made for one kind: `Automaton` takes the kind after its creating event. The
// runtime registers `DeSorte<VuePiece, kCommandes>` as "GAPECOM-GESTION".
template <class Automaton, const SortePiece& S>
class DeSorte : public Automaton {
 public:
  explicit DeSorte(host::Evt* evt) : Automaton(evt, S) {}
};

}  // namespace quarvo::suite
