// Purchasing services used when pieces are generated: site settings ("GCPSTE"), depots
// ("GCPDEPOT"), item-supplier links ("GAPARTFO") and invoice due dates ("GAPECH").
//
// Rule:
// - "GCPSTE": "LECTURE" with an identifier reads that settings row, without one the first row
//   (the site's settings), into "I_GCPSTE". "DEPOT" (depot by reference) gives the settings'
//   "GCPDEPOT_IDENT" (empty when none); it fails when there are no settings.
// - "GCPDEPOT": "DEPOT_PRINCIPAL" (depot by reference) gives the depot whose "PRINCIPAL" is 1,
//   else the first depot; it fails when there is no depot at all.
// - "GAPARTFO": "LECTURE_ET_CREATION" (article, supplier, create) reads the link of the article
//   with the supplier into "I_GAPARTFO"; when there is none and `create` is 1 it creates it
//   ("IDENT" from "ZUMNDOC", unit price = the article's "PUHT"). It fails when the link
//   neither exists nor may be created.
// - "GAPECH": "CREER_DEFAUT" (invoice, number, supplier, payment terms, date, amount, count)
//   replaces the invoice's due dates by one: date + the terms' "NB_JOURS", moved to the end of
//   its month when "FIN_MOIS" is 1 (the piece date itself without terms), for the amount.
//   It fails without an invoice identifier or date.
#pragma once

#include "suite/TableInterface.h"

namespace quarvo::suite {

class Gcpste : public TableInterface {
 public:
  explicit Gcpste(host::Evt* evt);

 private:
  void lecture(host::Evt* evt);
  void depot(host::Evt* evt);
};

class Gcpdepot : public TableInterface {
 public:
  explicit Gcpdepot(host::Evt* evt);

 private:
  void depotPrincipal(host::Evt* evt);
};

class Gapartfo : public TableInterface {
 public:
  explicit Gapartfo(host::Evt* evt);

 private:
  void lectureEtCreation(host::Evt* evt);
};

class Gapech : public TableInterface {
 public:
  explicit Gapech(host::Evt* evt);

 private:
  void creerDefaut(host::Evt* evt);
};

// A new identifier of `table` (base "GESCOM") from "ZUMNDOC", confirmed; empty when refused.
std::string numeroAchat(host::Automate& caller, const std::string& table);

}  // namespace quarvo::suite
