// "QUARVO-IMPORT_GENERER_DF", "_CF", "_BF", "_FF": the generation of purchasing pieces from a
// controlled staging table.
//
// The staged rows are read in piece-number order, one piece per "NUMERO_DOC". Each piece whose
// number does not exist yet in the kind's header table is created through the purchasing
// module's generation protocol (one "LIGNE_COPIEE" per staged line, fed through the exchange
// record "M_GENERE"), completed (reference, origin, number, requester), validated, settled when
// asked (quote requests, orders and receipts marked "SOLDE" 1, through "QUARVO-SOLDER") and, for
// orders, receipts and invoices, booked on the project budget: each line's budget line is found
// from its staged budget and its article's service ("MAJ_LIGNE"), and when the piece is complete
// the lines of one budget line are linked to it through one link row, found or created, with
// what they contribute by the rule every linking path shares (quarvo/frame/Apports.h): net of
// discounts, less what settling closed; the budget line, found or created, takes what the link
// row books (orders: committed amount; invoices, and receipts when the company books them:
// realised amounts), and its remaining figures follow unless they are set by hand. Invoices then
// get their due dates and project movements.
//
// Each new piece is one transaction: its header, lines, budget booking, link rows, due dates
// and settling are written whole or not at all. Pieces are committed by groups (a piece is a
// savepoint of its group), so that a large file does not pay one commit per piece. A piece whose
// number exists is skipped (only settled when asked), so running a file again, or after a run was
// cut short, creates nothing twice. A failed call of the purchasing module shows its text, sets the
// caller's error flag
// ("P_ERREUR", parameter 0 by reference) and abandons that piece; the run goes on.
//
// The four members are one implementation; `DifferencesGeneration` holds what tells them apart.
#pragma once

#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "host/automate/Parcours.h"
#include "host/table/Champ.h"
#include "host/table/Database.h"

namespace quarvo {

struct DifferencesGeneration {
  enum class Solde { Toujours, SaufSoldee, Jamais };

  const char* code;     // "DF", "CF", "BF", "FF"
  const char* staging;  // staging table
  const char* entete;   // piece header table, also the piece module and the link component
  bool moisSociete;     // the company's current month is read (V_ANMO)
  bool avoirs;          // staged "TYPE" 'A' makes a credit note, booked negatively
  bool majLigne;        // lines are booked on the budget ("MAJ_LIGNE")
  bool mouvementLien;   // receipts: a link booked on realised amounts brings the piece's
                        // accounting movement (invoices get theirs with the piece)
  bool resultats;       // orders: a results row and "AFRESU" "MAJ_AFRESU" per line
  bool calculRaf;       // invoices: "AFRESU" "CALCUL_RAF_D" per line
  bool numeroEntete;    // invoices: the supplier's number goes to the header's "NUMERO"
  bool echeances;       // invoices: due dates and project movements
  Solde solde;          // settling when the staged "SOLDE" is 1
};

// One kind per entry, its fields named.
// clang-format off
inline constexpr DifferencesGeneration kGenerationDf{
    .code = "DF", .staging = "IMM_PIECE_DF", .entete = "GAPEDEV",
    .moisSociete = false, .avoirs = false, .majLigne = false,
    .mouvementLien = false,
    .resultats = false, .calculRaf = false, .numeroEntete = false, .echeances = false,
    .solde = DifferencesGeneration::Solde::Toujours};
inline constexpr DifferencesGeneration kGenerationCf{
    .code = "CF", .staging = "IMM_PIECE_CF", .entete = "GAPECOM",
    .moisSociete = true, .avoirs = false, .majLigne = true,
    .mouvementLien = false,
    .resultats = true, .calculRaf = false, .numeroEntete = false, .echeances = false,
    .solde = DifferencesGeneration::Solde::SaufSoldee};
inline constexpr DifferencesGeneration kGenerationBf{
    .code = "BF", .staging = "IMM_PIECE_BF", .entete = "GAPEBL",
    .moisSociete = true, .avoirs = false, .majLigne = true,
    .mouvementLien = true,
    .resultats = false, .calculRaf = false, .numeroEntete = false, .echeances = false,
    .solde = DifferencesGeneration::Solde::SaufSoldee};
inline constexpr DifferencesGeneration kGenerationFf{
    .code = "FF", .staging = "IMM_PIECE_FF", .entete = "GAPEFAC",
    .moisSociete = true, .avoirs = true, .majLigne = true,
    .mouvementLien = false,
    .resultats = false, .calculRaf = true, .numeroEntete = true, .echeances = true,
    .solde = DifferencesGeneration::Solde::Jamais};
// clang-format on

class QUARVOImport_generer : public host::Parcours {
 public:
  QUARVOImport_generer(host::Evt* evt, const DifferencesGeneration& kind);
  ~QUARVOImport_generer() override;

  void debut(host::Evt* evt) override;
  void debut1(host::Evt* evt) override;
  void pour_tout(host::Evt* evt) override;
  void maj_ligne(host::Evt* evt);
  void fin1(host::Evt* evt) override;
  void sortie(host::Evt* evt) override;
  void message_erreur(host::Evt* evt);
  // A runtime fault in one of the handlers: reported, the piece abandoned, the caller told.
  void exception(host::Evt* evt) override;

 private:
  // A call of the piece module's generation protocol; on failure runs "MESSAGE_ERREUR".
  bool protocole(const char* label, host::Evt& evt);
  // A call of another module's interface; returns true on success.
  bool appeler(const char* module, const char* label, host::Evt& evt, const char* instance = "*");
  // Columns of the staged row last read (the traversal has moved on when "FIN1" runs).
  std::string staged(const char* column);
  host::Valeur stagedValeur(const char* column);
  void abandonnerPiece();
  void completerEntete();
  std::string demandeur(const std::string& code);
  void solder();
  void jauge();

  // The budget booking of one piece: the lines of one service in one budget, found by
  // "MAJ_LIGNE", booked together on one budget line through one link row when the piece ends.
  struct LienAReporter {
    std::string budget;   // "AFEBUD" "IDENT"
    std::string service;  // "AFPRES" "IDENT"
    // What a new budget line and link row take from the budget, the project and the service.
    host::Valeur budgetAffaire, budgetAffaireCode, budgetPiece, budgetDebut, budgetFin;
    host::Valeur affaire, affaireCode;
    host::Valeur serviceCode, serviceDesig, serviceUnite, servicePoste;
    std::vector<std::string> lignes;  // piece lines' "NUMERO"
  };
  void reporterSurBudgets();
  void reporterLien(const LienAReporter& lien, double qtt, const host::Valeur& dateMaj,
                    const host::Valeur& heureMaj);

  const DifferencesGeneration& kind_;
  host::Field& pErreur_;
  host::Field& vMo_;
  host::Field& vAn_;
  host::Field& vAnmo_;
  host::Field& vCodePartage_;
  host::Field& vDepotIdent_;
  host::Field& vCreerPiece_;
  host::Field& vPieceIdent_;
  host::Field& vAvoir_;
  host::Field& vCreerAflbud_;
  host::Field& vQte_;
  host::Field& vHt_;
  host::Field& vChoix_;
  host::Field& vCritereAchat_;
  host::Field& vPrestationIdent_;
  host::Field& pAffa_;
  host::Field& pPost_;
  host::Field& pAnmo_;
  host::Field& vJauge1_;
  host::Field& vJauge2_;
  host::Field& vTexte_;

  host::Table pieces_;
  host::Table genere_;
  host::Table gcptxtva_;
  host::Table afebud_;
  host::Table aflbud_;
  host::Table quarvo_;
  host::Table iAfsoci_;
  host::Table iAfpara_;
  host::Table iGcpste_;
  host::Table iGcpfour_;
  host::Table iGcpartic_;
  host::Table iAfaffa_;
  host::Table iAfpres_;

  std::unique_ptr<host::TransactionsGroupees> lot_;  // pieces committed by groups
  std::unique_ptr<host::Transaction> piece_;         // the piece being written
  host::Row ligne_;                                  // the staged row last read, as it was
  bool generationOuverte_ = false;
  bool boiteOuverte_ = false;
  std::string fournisseurIdent_;
  std::string regime_;
  int64_t saisieAna_ = 0;
  int64_t pasJauge_ = 1;
  bool receptions_ = false;  // the company books goods received ("OPTION9" "O")
  int64_t rang_ = 0;         // lines copied into the current piece
  std::vector<LienAReporter> liens_;
};

class QUARVOImport_generer_df : public QUARVOImport_generer {
 public:
  explicit QUARVOImport_generer_df(host::Evt* evt) : QUARVOImport_generer(evt, kGenerationDf) {}
};
class QUARVOImport_generer_cf : public QUARVOImport_generer {
 public:
  explicit QUARVOImport_generer_cf(host::Evt* evt) : QUARVOImport_generer(evt, kGenerationCf) {}
};
class QUARVOImport_generer_bf : public QUARVOImport_generer {
 public:
  explicit QUARVOImport_generer_bf(host::Evt* evt) : QUARVOImport_generer(evt, kGenerationBf) {}
};
class QUARVOImport_generer_ff : public QUARVOImport_generer {
 public:
  explicit QUARVOImport_generer_ff(host::Evt* evt) : QUARVOImport_generer(evt, kGenerationFf) {}
};

}  // namespace quarvo
