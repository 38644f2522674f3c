// What a purchasing piece books on a budget line, whichever path links it: the pointing and the
// imputation, the import's generation, and the interface's withdraw and recompute (which the
// figure audit runs). The rule is stated here once; every path calls these functions.
//
// 1. A piece line contributes its net amount (`apportLigne`):
//    - unit price: the line's price less the line's discount, less the piece's discount, less the
//      piece's prompt-payment discount; then, when the piece's gross amount "BRUT" is not 0, the
//      line's share of the piece's carriage "PORT_HT" and costs "FRAIS_HT" (in proportion of the
//      line's "HT" to "BRUT"), divided by the line's quantity so that each unit bears its part;
//    - quantity: for orders and goods-received notes what is left after settling ("QTE" less
//      "QTE_SOLDEE"), with the processed quantity "QTT"; for invoices the quantity as invoiced,
//      negative on a credit note ("TYPE" "A"), and no processed quantity;
//    - amount: quantity × net unit price, rounded to the cent.
//    A line whose quantity comes to 0 is linked to nothing; a link row with no such line is not
//    written.
// 2. A link row books on its budget line (`apportLien`): an order its "HT" on the committed
//    amount "VENG"; an invoice or a time entry its "HT" on the realised amounts "VREA"; a
//    goods-received note, only when the company's "OPTION9" is "O", the part received and not yet
//    invoiced, "HT" / "QTE" × ("QTE" − "QTT") rounded to the cent, on "VREA"; nothing otherwise.
// 3. After its realised amounts change, a budget line's remaining figures and progress follow
//    (`restesEtAvancement`): unless "AFFECTE" is "O" (remaining figures set by hand), "HRAF" =
//    "HBUD" − "HREA" and "VRAF" = "VBUD_D" − "VREA"[0], both 0 when nothing is budgeted or when
//    "HRAF" would be negative, "VRAF" never below 0, its three elements equal; "AVT" is the part
//    of the hours budget done, or else of the amount budget, in percent, held within 0 and 100.
#pragma once

#include <functional>
#include <string>

#include "host/table/Table.h"
#include "host/value/Monnaie.h"

namespace quarvo::frame {

// A column of the piece's header or line, by name.
using Colonne = std::function<host::Valeur(const std::string&)>;

// What the net price and quantity of a line depend on in its piece's header.
struct EnteteAchat {
  bool facture = false;  // an invoice: quantity as invoiced, no processed quantity
  bool avoir = false;    // a credit-note invoice: quantities count negatively
  double tauxRemise = 0;
  double tauxEscompte = 0;
  host::Monnaie brut;
  host::Monnaie portHt;
  host::Monnaie fraisHt;
};

struct LigneAchat {
  host::Monnaie puht;
  double tauxRemise = 0;
  host::Monnaie ht;
  double qte = 0;
  double qteSoldee = 0;
  double qtt = 0;
};

struct ApportLigne {
  host::Monnaie puht;  // net unit price, not rounded
  double qte = 0;
  double qtt = 0;
  host::Monnaie ht;  // qte × puht, to the cent
};

struct ApportLien {
  host::Monnaie engage;
  host::Monnaie realise;
};

// `table` is the header table ("GAPECOM", "GAPEBL", "GAPEFAC").
EnteteAchat enteteAchat(const std::string& table, const Colonne& colonne);
LigneAchat ligneAchat(const Colonne& colonne);
ApportLigne apportLigne(const EnteteAchat& entete, const LigneAchat& ligne);

// `receptions`: the company books received and not yet invoiced goods ("OPTION9" "O").
ApportLien apportLien(const std::string& composant, const host::Monnaie& ht, double qte, double qtt,
                      bool receptions);
// The same, for the current row of a cursor on the link table.
ApportLien apportLien(host::Table& lien, bool receptions);

// Brings the remaining figures and progress of the budget line row held by `ligne` (a cursor on
// "AFLBUD" or its interface record) in line with its realised amounts. Writes the row's columns,
// not the database.
void restesEtAvancement(host::Table& ligne);

}  // namespace quarvo::frame
