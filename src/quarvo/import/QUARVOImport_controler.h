// "QUARVO-IMPORT_CONTROLER_DF", "_CF", "_BF", "_FF": the control of a staged import file.
//
// One traversal of the kind's staging table checks every staged row against the reference
// tables (piece number and date, supplier, project section, budget, article and its service,
// VAT rate of the supplier's regime) and writes one "IMM_ERREUR" row per fault; no check stops
// the traversal. On leaving, every staged row of a piece that got an error in this run is
// deleted, so the generation sees only sound pieces. The invoice control also stages, for each
// sound invoice line that is not valid, the matching credit-note line (number "A" + the last
// nine characters of the invoice's number, "TYPE" "A").
//
// Called with one parameter by reference, the caller's error flag ("P_ERREUR"): 0 when no row
// was refused, 1 otherwise. The whole control is one transaction: a control that is cut short
// leaves neither error rows nor half-cleaned staging behind.
//
// The four members are one implementation; `DifferencesControle` holds what tells them apart.
#pragma once

#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "host/automate/Parcours.h"
#include "host/table/Champ.h"
#include "host/table/Database.h"

namespace quarvo {

struct DifferencesControle {
  const char* code;     // "DF", "CF", "BF", "FF"
  const char* staging;  // staging table, also the "COMPOSANT" of its error rows
  const char* prefixe;  // "DESIG" of an error row, before the piece number
  bool budget;          // the budget code is checked
  bool avoirs;          // invalid invoice lines get their credit-note line staged
};

inline constexpr DifferencesControle kControleDf{"DF", "IMM_PIECE_DF", "Devis fournisseur no ",
                                                 false, false};
inline constexpr DifferencesControle kControleCf{"CF", "IMM_PIECE_CF", "Commande fournisseur no ",
                                                 true, false};
inline constexpr DifferencesControle kControleBf{"BF", "IMM_PIECE_BF", "Bon de réception no ", true,
                                                 false};
inline constexpr DifferencesControle kControleFf{"FF", "IMM_PIECE_FF", "Facture fournisseur no ",
                                                 true, true};

class QUARVOImport_controler : public host::Parcours {
 public:
  QUARVOImport_controler(host::Evt* evt, const DifferencesControle& kind);
  ~QUARVOImport_controler() override;

  void debut(host::Evt* evt) override;
  void pour_tout(host::Evt* evt) override;
  void sortie(host::Evt* evt) override;
  void ecrire_erreur(host::Evt* evt);
  void supprimer_erreurs(host::Evt* evt);

 private:
  std::string staged(const char* column);
  void erreur(const std::string& message);
  void jauge();

  const DifferencesControle& kind_;
  host::Field& pErreur_;
  host::Field& vDateDeb_;
  host::Field& vDateFin_;
  host::Field& vIdent_;
  host::Field& vCritereAchat_;
  host::Field& vPrestationIdent_;
  host::Field& vJauge1_;
  host::Field& vJauge2_;
  host::Field& vCmt_;
  host::Field& pMessage1_;
  host::Field& pMessage2_;
  host::Table erreurs_;
  host::Table gcptxtva_;
  host::Table iAfpara_;
  host::Table iAfsoci_;
  std::unique_ptr<host::Table> afebud_;  // the quote control has no budget cursor
  host::Table iGcpartic_;
  host::Table iGcpfour_;
  std::unique_ptr<host::Table> staging2_;  // invoices: where credit-note lines are added

  std::unique_ptr<host::Transaction> transaction_;
  std::string premiereErreur_;  // first error number of this run
  std::string pieceCourante_;   // "NUMERO_DOC" of the row being checked
  bool ligneEnErreur_ = false;
  int64_t pasJauge_ = 1;
  // Credit-note lines added in this run, with the invoice number they come from.
  std::vector<std::pair<std::string, host::RowId>> avoirs_;
};

class QUARVOImport_controler_df : public QUARVOImport_controler {
 public:
  explicit QUARVOImport_controler_df(host::Evt* evt) : QUARVOImport_controler(evt, kControleDf) {}
};
class QUARVOImport_controler_cf : public QUARVOImport_controler {
 public:
  explicit QUARVOImport_controler_cf(host::Evt* evt) : QUARVOImport_controler(evt, kControleCf) {}
};
class QUARVOImport_controler_bf : public QUARVOImport_controler {
 public:
  explicit QUARVOImport_controler_bf(host::Evt* evt) : QUARVOImport_controler(evt, kControleBf) {}
};
class QUARVOImport_controler_ff : public QUARVOImport_controler {
 public:
  explicit QUARVOImport_controler_ff(host::Evt* evt) : QUARVOImport_controler(evt, kControleFf) {}
};

}  // namespace quarvo
