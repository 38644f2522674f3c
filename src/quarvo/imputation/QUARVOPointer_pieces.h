// "QUARVO-POINTER_PIECES": proposes, for each purchasing piece of a selection, the budget lines
// its lines belong to (the pointing).
//
// Parameters (by value): lowest and highest creation date, piece kind ("T" all, "C" orders,
// "B" goods-received notes, "F" invoices), arbitration (1: the first suitable budget line wins
// and a missing one is created), lowest and highest document number, project code (empty:
// no bound). For each piece it writes one record into "M_EAPPR", one per article line into
// "M_LAPPR" and one per budget line found into "M_VAPPR", the session's work tables that the
// imputation reads afterwards. A piece linked before and changed since is first cancelled
// ("QUARVO-ANNULER1"); every piece is analysed for the accounting link ("ANALYSER"), and a
// piece the analysis refuses is recorded with all its lines in error. The three kinds are one
// procedure over the table of differences in the source.
#pragma once

#include <map>
#include <optional>
#include <set>

#include "host/automate/Traitmnt.h"
#include "host/table/Champ.h"
#include "quarvo/frame/PieceKinds.h"

namespace quarvo {

class QUARVOPointer_pieces : public host::Traitmnt {
 public:
  explicit QUARVOPointer_pieces(host::Evt* evt);

  void debut(host::Evt* evt) override;
  void faire(host::Evt* evt) override;
  void pointer_pieces_cf(host::Evt* evt);
  void pointer_pieces_bf(host::Evt* evt);
  void pointer_pieces_ff(host::Evt* evt);
  void creer_eappr(host::Evt* evt);
  void creer_lappr(host::Evt* evt);
  void modifier_lappr(host::Evt* evt);
  void modifier_eappr(host::Evt* evt);
  void pointer_budgets(host::Evt* evt);
  void pointer_prestation(host::Evt* evt);
  void creer_vappr(host::Evt* evt);
  void creer_aflbud(host::Evt* evt);

  using Sorte = frame::SorteSelection;  // one kind of piece: its tables and captions

 private:
  void pointerPieces(host::Evt* evt, const Sorte& sorte);
  void pointerPiece(host::Evt* evt, const Sorte& sorte, host::Table& header);
  // A column of the current header or line of the kind being pointed, read by name.
  host::Valeur entete(const std::string& column);
  host::Valeur ligne(const std::string& column);
  bool appelInterne(const std::string& label, host::Evt* evt);
  std::string clePiece();
  std::string cleLigne();
  // The service that groups the current article's purchases (asked once per line).
  std::optional<std::string> prestationDeLArticle();

  host::Field& vDateMin_;
  host::Field& vDateMax_;
  host::Field& vTypePiece_;
  host::Field& vArbitrage_;
  host::Field& vNumMin_;
  host::Field& vNumMax_;
  host::Field& vAffaCode_;
  host::Field& mo_;
  host::Field& an_;
  host::Field& vDateFin_;
  host::Field& vEtatPiece_;
  host::Field& vEComposant_;
  host::Field& vLComposant_;
  host::Field& vSecanCode_;
  host::Field& vErreur_;
  host::Field& vNbVentil_;
  host::Field& vFlag_;
  host::Field& vJauge1_;
  host::Field& vJauge2_;
  host::Field& vCritereAchat_;
  host::Field& vPrestationIdent_;
  host::Field& vAflbudIdent_;  // identifier of a budget line created under arbitration

  host::Table quarvo2_;
  host::Table gapecom_;
  host::Table gapebl_;
  host::Table gapefac_;
  host::Table gaplcom_;
  host::Table gaplbl_;
  host::Table gaplfac_;
  host::Table iAfpara_;
  host::Table iAfsoci_;
  host::Table afebud_;
  host::Table aflbud_;
  host::Table iAfaffa_;
  host::Table iGcpartic_;
  host::Table iAfpres_;
  host::Table eappr_;
  host::Table lappr_;
  host::Table vappr_;

  const Sorte* sorte_ = nullptr;
  host::Table* entete_ = nullptr;
  host::Table* lignes_ = nullptr;
  std::optional<std::optional<std::string>> prestation_;  // cached per line
  std::set<std::string> servicesLus_;                     // services known to exist
};

}  // namespace quarvo
