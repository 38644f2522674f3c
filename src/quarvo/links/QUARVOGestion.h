// "QUARVO-GESTION": the link document of one budget line. Its lines are the link rows of the
// line, shown in groups, one tab each: "P1" orders, "P2" goods-received notes, "P3" invoices (or
// time entries when the company does not link orders and receipts). On a line the controller
// types or chooses a piece; the document checks that the piece may be linked (validated when the
// company asks for it, not dated after the current month, accepted by the accounting analysis,
// not on the line yet) and computes the part of it that belongs to the budget line (its lines of
// the line's service and project, at their net amount). From a line it opens the piece, validates
// it, transforms it into the next piece of the chain (the new piece is then added to the
// document), settles it, or opens the time pointing of a personnel service.
//
// Saving is one transaction: the budget line's figures are withdrawn, the changed link rows
// written and the figures booked again; leaving then books nothing more. Until the save every
// change stays in the memory table "MEM:QUARVO": abandoning leaves the database as it was.
//
// Created with the budget, the budget line and the modes (see Gestion_doc), by value. The
// document keeps the budget, line, project and service it works on in fields of its own.
#pragma once

#include <string>
#include <vector>

#include "host/automate/Gestion_doc.h"
#include "host/table/Table.h"

namespace quarvo {

class QUARVOGestion : public host::Gestion_doc {
 public:
  explicit QUARVOGestion(host::Evt* evt);

  void debut_tri(host::Evt* evt);
  void debut(host::Evt* evt) override;
  void debut_activation(host::Evt* evt);
  void selection(host::Evt* evt);
  void lst_liste_vide(host::Evt* evt);
  void afficher_ligne(host::Evt* evt);
  void modification(host::Evt* evt);
  void creation(host::Evt* evt);
  void debut_visualisation(host::Evt* evt);
  void debut_modification(host::Evt* evt);
  void debut_creation(host::Evt* evt);
  void avant_suppression(host::Evt* evt);
  void debut_ligne(host::Evt* evt);
  void debut_fiche_vide(host::Evt* evt);
  void validation(host::Evt* evt) override;
  void fin_modification(host::Evt* evt);
  void fin_creation(host::Evt* evt);
  void apres_suppression(host::Evt* evt);
  void dialogue(host::Evt* evt);
  void p1(host::Evt* evt);
  void p1_entree(host::Evt* evt);
  void cacher_fonctions(host::Evt* evt);
  void interdire_fonctions(host::Evt* evt);
  void lst_c1(host::Evt* evt);
  void lst_c1_choisir(host::Evt* evt);
  void piece_saisir(host::Evt* evt);
  void piece_choisir(host::Evt* evt);
  void piece_controler(host::Evt* evt);
  void piece_calculer(host::Evt* evt);
  void afeffo_saisir(host::Evt* evt);
  void afeffo_choisir(host::Evt* evt);
  void afeffo_controler(host::Evt* evt);
  void afeffo_calculer(host::Evt* evt);
  void consulter_piece(host::Evt* evt);
  void afeffo_consulter(host::Evt* evt);
  void piece_consulter(host::Evt* evt);
  void valider_piece(host::Evt* evt);
  void transformer_br(host::Evt* evt);
  void transformer_facture(host::Evt* evt);
  void transformer__3__4(host::Evt* evt);
  void ajouter_piece(host::Evt* evt);
  void solder_ral(host::Evt* evt);
  void solder_raf(host::Evt* evt);
  void pointer_temps(host::Evt* evt);
  void sauvegarde(host::Evt* evt) override;
  void avant_sortie(host::Evt* evt);
  void calcul_totaux(host::Evt* evt);
  void b_valid_doc(host::Evt* evt);
  void b_aband_doc(host::Evt* evt);
  void ctrl_debut_modif_doc(host::Evt* evt);

 protected:
  bool ligneAffichee(host::Table& lignes) override;

 private:
  // Runs one of the document's own labels with an empty event; its outcome.
  int executer(const std::string& label);
  // A column of an interface record ("I_AFEBUD") as the last read left it.
  host::Valeur lu(const std::string& record, const std::string& column);
  // A column of the current line.
  host::Valeur colonne(const std::string& column) { return ligne().valeur(column); }
  void message(const std::string& number, std::vector<std::string> args = {});
  bool question(const std::string& number, std::vector<std::string> args = {});
  // Refuses the event on the piece column (the person stays there).
  void refuserSaisie(host::Evt* evt);
  // Fills the current line from the piece read in its interface record and the computation.
  void remplirLigne(const std::string& composant, const std::string& record);
  void viderLigne();
  // The checks every kind of piece passes; each shows its message and fails the event.
  // A row of the document other than the current line already holds the piece typed (88).
  bool dejaSurLaLigne(const std::string& composant, host::Evt* evt);
  // The piece is dated after the company's current month (89).
  bool apresLeMois(const host::Date& date, host::Evt* evt);
  // Reads the line's piece again and brings the line in step with it (after the piece was
  // consulted or settled); the line is then validated.
  void suivrePiece();
  std::string tableLignes() const;
  // The lines of the document that count in the free quantity of the budget line.
  double quantiteLibre();
  // The current tab for the group.
  void activerOnglet(const std::string& tab);
  bool liaisonGroupes() const { return vLiaisonG_.text() == "O"; }

  host::Field& pident1_;
  host::Field& pident2_;
  host::Field& pmode_;
  host::Field& vafebudHt_;
  host::Field& vetat_;
  host::Field& vetatPiece_;
  host::Field& vorigine_;
  host::Field& vtotGapecom_;
  host::Field& vtotGapebl_;
  host::Field& vtotGapefac_;
  host::Field& n_;
  host::Field& m_;
  host::Field& vmo_;
  host::Field& van_;
  host::Field& vanmo_;
  host::Field& vdebmo_;
  host::Field& vfinmo_;
  host::Field& vcompo_;
  host::Field& vtypeCible_;
  host::Field& videntCible_;
  host::Field& verreur_;
  host::Field& vtableVide_;
  host::Field& vdialogue_;
  host::Field& vpointerTemps_;
  host::Field& vdate_;
  host::Field& vaflbudQte_;
  host::Field& vqte_;
  host::Field& vqtt_;
  host::Field& vht_;
  host::Field& vvalidDoc_;
  host::Field& vtransformer_;
  host::Field& vchoixPiece_;
  host::Field& vpointerIdent_;
  host::Field& vctrlCode_;
  host::Field& vLibPiece_;
  host::Field& vLibPiece1_;
  host::Field& vLibPiece2_;
  host::Field& vLibelle_;
  host::Field& vLibel_;
  host::Field& vChoix_;
  host::Field& vCritereAchat_;
  host::Field& vPrestationIdent_;
  // What the document works on, read once when it opens.
  host::Field& vBudgetPiece_;
  host::Field& vLigneNumero_;
  host::Field& vLigneDesig_;
  host::Field& vAffaIdent_;
  host::Field& vAffaCode_;
  host::Field& vPresIdent_;
  host::Field& vNature_;
  host::Field& vQbud_;
  host::Field& vCodeEtat_;
  host::Field& vLiaisonG_;
  host::Field& vOption8_;
  host::Table origine_;
  host::Table memoire_;
  host::Table liens_;
  host::Table aflbud_;
  host::Table aflffo_;
  host::Table afpers_;
  host::Table afpfst_;
  // Link rows deleted since the last save: their time pointing goes at the save.
  std::vector<std::string> supprimees_;
};

}  // namespace quarvo
