// "QUARVO-SOLDER": settles what remains open on a quote request, order or goods-received note.
//
// Created with the piece's header table ("GAPEDEV", "GAPECOM" or "GAPEBL") and identifier (by
// value). Every line whose quantity differs from its carried-forward quantity is settled for
// the difference in the piece-line ("GCPX") and stock ("GCPSTOCK") services, an order's lots
// are settled or removed by the lot module, and the piece itself is settled with the supplier
// service ("GCPFOUR") for its amounts: "HT"/"TTC" when all was carried forward, else the
// carried-forward amounts "MTNT_HT"/"MTNT_TTC". Any other table fails the call at once; so does
// a piece that does not exist, which is never half-settled.
#pragma once

#include <memory>

#include "host/automate/Traitmnt.h"
#include "host/table/Table.h"

namespace quarvo {

class QUARVOSolder : public host::Traitmnt {
 public:
  explicit QUARVOSolder(host::Evt* evt);

  void init(host::Evt* evt) override;
  void debut(host::Evt* evt) override;
  void faire(host::Evt* evt) override;
  void traite_ligne(host::Evt* evt);
  void traite_entete(host::Evt* evt);
  void supprimer_lots_inutiles(host::Evt* evt);

 private:
  void service(const char* module, const char* label, std::vector<host::Arg> args,
               const char* instance = "*");

  host::Field& pTable_;
  host::Field& pieceIdent_;
  host::Field& typePiece_;
  host::Field& avecLots_;
  host::Field& nomCompoLot_;
  std::unique_ptr<host::Table> entetes_;  // "LES_ENTETES", on the table the call names
  std::unique_ptr<host::Table> lignes_;   // "LES_LIGNES"
  bool lignesFinies_ = false;
};

}  // namespace quarvo
