// "QUARVO-ANALYSER": can a purchasing piece be carried into the accounting and analytical link?
//
// Created with the piece's header table ("GAPECOM", "GAPEBL" or "GAPEFAC"), its "IDENT", the
// silence flag ("P_MUET" 1: no dialog), an object passed on to the section control, and the
// error flag "P_ERREUR" by reference. "DEBUT" reads the company, the purchasing parameters and
// the accounting link's set-up (purchases journal, account grouping mode); "FAIRE" walks the
// piece: the analytical sections of the header and of the lines, the purchase account of each
// priced line (from the supplier or the item's grouping criterion, the VAT regime and code),
// the fees and carriage accounts, and the analytical post of every account found.
//
// Nothing is stored but one "IMM_ERREUR" row per problem (numbered on from the table's highest
// "IDENT", ten digits), "P_ERREUR" := 1 when there is any, and, unless silent, an "Attention"
// box per problem. A missing purchases journal stops the analysis at its start with one error
// row and "P_ERREUR" 1. A piece kind other than the three above, or a header that does not
// exist, analyses nothing and leaves "P_ERREUR" at 0. The automaton always ends itself.
#pragma once

#include <string>

#include "host/automate/Traitmnt.h"
#include "host/table/Champ.h"

namespace quarvo {

class QUARVOAnalyser : public host::Traitmnt {
 public:
  explicit QUARVOAnalyser(host::Evt* evt);

  void debut_attente(host::Evt* evt) override;
  void stop_attente(host::Evt* evt) override;
  void valeur_attente(host::Evt* evt) override;
  void fin_attente(host::Evt* evt) override;
  void abandon_attente(host::Evt* evt) override;
  void debut(host::Evt* evt) override;
  void faire(host::Evt* evt) override;

  // One per piece kind, told apart by the piece-kind table.
  void analyser_gapecom(host::Evt* evt);
  void analyser_gaplcom(host::Evt* evt);
  void analyser_gapebl(host::Evt* evt);
  void analyser_gaplbl(host::Evt* evt);
  void analyser_gapefac(host::Evt* evt);
  void analyser_gaplfac(host::Evt* evt);

  void analyser_entete(host::Evt* evt);
  void analyser_ligne(host::Evt* evt);
  void analyser_pied(host::Evt* evt);
  void compte_achat(host::Evt* evt);
  void critere_regroupement_a(host::Evt* evt);
  void lecture_compte(host::Evt* evt);
  void ecrire_erreur(host::Evt* evt);

 private:
  // One analysed piece kind: its tables, its own labels and the label key of its caption.
  struct Kind;
  static const Kind kKinds[];
  static const Kind* kindOf(const std::string& headerTable);

  void analyserPiece(const Kind& kind);
  void analyserLignes(const Kind& kind);
  // A column of the piece's header ("V_ECOMPOSANT") or current line ("V_LCOMPOSANT").
  host::Valeur entete(const std::string& column);
  host::Valeur ligne(const std::string& column);
  // "LECTURE_SIMPLE" of the accounting link's configuration (integrated or by file).
  void lectureSimple(const std::string& genre, const std::string& cle, host::Field& result);
  // The section control of "VCSECT" for the piece; an error row when it refuses.
  void controlerSection();
  // Sets the four texts of an error row and writes it.
  void erreur(const std::string& compo, const std::string& code, const std::string& desig,
              const std::string& cmt);
  // Resumes the numbering after the highest "IDENT" of the error table.
  void reprendreNumerotation();

  // Parameters.
  host::Field& pcomposant_;
  host::Field& pcomposantIdent_;
  host::Field& pMuet_;
  host::Field& pObjet_;
  host::Field& pErreur_;
  // Working fields.
  host::Field& vtrf_;
  host::Field& vmachat_;
  host::Field& vnumjl_;
  host::Field& vEcomposant_;
  host::Field& vLcomposant_;
  host::Field& vcsect_;
  host::Field& vnumcp_;
  host::Field& vcpost_;
  host::Field& vmt_;
  host::Field& vrem_;
  host::Field& vesc_;
  host::Field& vLibel_;
  host::Field& vLibPiece_;
  host::Field& pIdent_;
  host::Field& pCompo_;
  host::Field& pCode_;
  host::Field& pDesig_;
  host::Field& pCmt_;
  host::Field& pMessage1_;
  host::Field& pMessage2_;
  // Tables.
  host::Table gapecom_;
  host::Table gaplcom_;
  host::Table gapebl_;
  host::Table gaplbl_;
  host::Table gapefac_;
  host::Table gaplfac_;
  host::Table iAfsoci_;
  host::Table immErreur_;
  host::Table iGcpparam_;
  host::Table iGcpfour_;
  host::Table iGcpartic_;
  host::Table iAfcomp_;
  // Columns.
  host::Champ gapecomIdent_;
  host::Champ gaplcomNumero_;
  host::Champ gaplcomArticle_;
  host::Champ gaplcomHt_;
  host::Champ gapeblIdent_;
  host::Champ gaplblNumero_;
  host::Champ gaplblArticle_;
  host::Champ gaplblHt_;
  host::Champ gapefacIdent_;
  host::Champ gaplfacNumero_;
  host::Champ gaplfacArticle_;
  host::Champ gaplfacHt_;
  host::Champ liaisonC_;
  host::Champ erreurIdent_;
  host::Champ erreurComposant_;
  host::Champ erreurCode_;
  host::Champ erreurDesig_;
  host::Champ erreurCmt_;
  host::Champ saisieAnaA_;
  host::Champ gapffouIdent_;
  host::Champ gcpcrit1Ident_;
  host::Champ gcpcrit2Ident_;
  host::Champ gcpcrit3Ident_;
  host::Champ cpost_;
  // Whether "P_IDENT" was taken from the error table yet.
  bool numerotationLue_ = false;
};

}  // namespace quarvo
