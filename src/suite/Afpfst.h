// "AFPFST": the time pointing of personnel services, kept per link row ("AFPFST" table, owned by
// this module; the link rows "QUARVO" are the project module's and only read here).
//
// Rule: "PURGER_QUARVO" (link identifier) deletes every pointing row of that link
// ("QUARVO_IDENT"); it succeeds also when there was none. "GESTION" (link identifier, modes
// text) opens the link's pointing: when the link has none yet and the modes hold "C" (create),
// it creates it, one row numbered by "ZUMNDOC" with what the link row says of it: the link
// ("QUARVO_IDENT"), the piece's date ("DATE_POINTAGE" = "DATE_PIECE"), its quantity and amount
// ("QTE", "HT"); the number and the row are one transaction. It succeeds, creating nothing
// when the pointing exists or the modes do not create; it fails when the link does not exist.
#pragma once

#include "host/automate/Interface2.h"

namespace quarvo::suite {

class Afpfst : public host::Interface2 {
 public:
  bool reutilisable() const override { return true; }  // keeps nothing between calls
  explicit Afpfst(host::Evt* evt);

 private:
  void gestion(host::Evt* evt) override;
};

}  // namespace quarvo::suite
