#include "quarvo/report/QUARVOExpetat1.h"

#include "host/session/Session.h"
#include "quarvo/report/Libelles.h"

namespace quarvo {

using namespace host;

QUARVOExpetat1::QUARVOExpetat1(Evt* evt)
    : Export(evt),
      pFichier_(chaine("P_FICHIER")),
      vLibel_(chaine("V_LIBEL")),
      vLibPiece1_(chaine("V_LIB_PIECE1")),
      vLibPiece2_(chaine("V_LIB_PIECE2")),
      vAfaffaDesig_(chaine("V_AFAFFA_DESIG")),
      vBudget_(chaine("V_BUDGET")),
      vBudgetDesig_(chaine("V_BUDGET_DESIG")),
      vPrestation_(chaine("V_PRESTATION")),
      vPrestationDesig_(chaine("V_PRESTATION_DESIG")),
      vType_(chaine("V_TYPE")),
      vPiece_(chaine("V_PIECE")),
      vDatePiece_(date("V_DATE_PIECE")),
      vDisponible_(monnaie("V_DISPONIBLE")),
      vSolde_(monnaie("V_SOLDE")),
      vPrestationEnCours_(chaine("V_PRESTATION_EN_COURS")),
      iAfaffa_(this, nomBase(), "I_AFAFFA", ""),
      iAfebud_(this, nomBase(), "I_AFEBUD", ""),
      iAflbud_(this, nomBase(), "I_AFLBUD", "") {
  lierParametres(evt, {{&pFichier_, 0}});
  nomBase("VOVOVA");
  fichier(pFichier_.text());
  format("EXCEL1");
  mode("SI");
  nomTable("M_APPR1");
  planTri("($TRI$",
          {"M_APPR1.IDENT", "M_APPR1.CRITERE", "M_APPR1.AFAFFA_CODE", "M_APPR1.AFEBUD_UNIQ",
           "M_APPR1.AFLBUD_NUMERO", "M_APPR1.TYPE", "M_APPR1.PIECE"});
  zones({"CRITERE", "CRITERE_DESIG", "AFAFFA_CODE", "V_AFAFFA_DESIG", "V_BUDGET", "V_BUDGET_DESIG",
         "V_PRESTATION", "V_PRESTATION_DESIG", "V_TYPE", "V_PIECE", "V_DATE_PIECE", "ORIGINE",
         "BUDGETE", "ENGAGE", "V_DISPONIBLE", "RECEPTIONNE", "FACTURE", "V_SOLDE"});
  addBranch("DEBUT", [this](Evt* e) { debut(e); });
  addBranch("POUR_TOUT", [this](Evt* e) { pour_tout(e); });
}

std::string QUARVOExpetat1::libelle(const std::string& key) {
  vLibel_.set("");
  EvtParamRef evt{val(key), ref(vLibel_)};
  appelerProcedure("*", "COMMUN", "INTERFACE", "LIRE_LIBEL", &evt, -1);
  return vLibel_.text();
}

bool QUARVOExpetat1::lire(const std::string& module, const std::string& ident) {
  EvtParamRef evt{val(ident)};
  appelerProcedure("*1", module, "INTERFACE", "LECTURE", &evt, -1);
  return erreurMethode() == 0;
}

void QUARVOExpetat1::debut(Evt*) {
  EvtParamRef societe{val("SOCIETE")};
  appelerProcedure("*1", "AFSOCI", "INTERFACE", "LECTURE_CODE", &societe, -1);
  vLibPiece1_.set(libelle("PIECE_DEVIS_V1"));
  vLibPiece2_.set(libelle("PIECE_COMMANDE_V1"));
}

void QUARVOExpetat1::pour_tout(Evt* evt) {
  Table& row = courant();
  std::string affaire = row.valeur("AFAFFA_IDENT").toChaine();
  std::string budget = row.valeur("AFEBUD_IDENT").toChaine();
  std::string ligne = row.valeur("AFLBUD_IDENT").toChaine();
  std::string lien = row.valeur("QUARVO_IDENT").toChaine();

  // 1. The project, budget, line and link of the row, and the linked piece.
  if (affaire != affaireLue_) affaireLue_ = lire("AFAFFA", affaire) ? affaire : std::string();
  if (budget != budgetLu_) budgetLu_ = lire("AFEBUD", budget) ? budget : std::string();
  if (ligne != ligneLue_) ligneLue_ = lire("AFLBUD", ligne) ? ligne : std::string();
  // The kind of a piece row is its link's component, which the selection turned into the row's
  // type: the type gives it back without reading the link again.
  std::string type = row.valeur("TYPE").toChaine();
  const char* composant = lien.empty()  ? ""
                          : type == "2" ? "GAPECOM"
                          : type == "3" ? "GAPEBL"
                          : type == "4" ? "GAPEFAC"
                          : type == "5" ? "AFEFFO"
                                        : "";

  // 2. to 4. Labels.
  vAfaffaDesig_.set(affaireLue_.empty() ? std::string() : iAfaffa_.valeur("DESIG").toChaine());
  std::string piece = budgetLu_.empty() ? std::string() : iAfebud_.valeur("PIECE").toChaine();
  std::string origine = budgetLu_.empty() ? std::string() : iAfebud_.valeur("ORIGINE").toChaine();
  vBudget_.set(
      quarvo::report::legendeOrigine(piece, origine, vLibPiece1_.text(), vLibPiece2_.text()) +
      piece);
  vBudgetDesig_.set(budgetLu_.empty() ? std::string() : iAfebud_.valeur("DESIG").toChaine());
  bool ligneLue = !ligneLue_.empty();
  vPrestation_.set(ligneLue ? iAflbud_.valeur("AFPRES_CODE").toChaine() : std::string());
  vPrestationDesig_.set(
      ligneLue ? quarvo::report::prefixeChapitre(iAflbud_.valeur("CHAPITRE2").toChaine()) +
                     iAflbud_.valeur("DESIG").toChaine()
               : std::string());

  // 5. Kind of row, piece and date.
  vType_.set("0AFEBUD");
  vPiece_.set("");
  vDatePiece_.set(Date());
  if (type != "0") {
    vType_.set(type + composant);
    vPiece_.set(row.valeur("PIECE").toChaine());
    vDatePiece_.assign(row.valeur("DATE_PIECE"));
  }

  // 6. to 8. Running amounts of the budget line, never below 0.
  if (ligne != vPrestationEnCours_.text()) {
    vDisponible_.set(Monnaie());
    vSolde_.set(Monnaie());
  }
  Monnaie disponible =
      vDisponible_.monnaie() + toMonnaie(row.valeur("BUDGETE")) - toMonnaie(row.valeur("ENGAGE"));
  vDisponible_.set(disponible < Monnaie() ? Monnaie() : disponible);
  Monnaie solde =
      vSolde_.monnaie() + toMonnaie(row.valeur("ENGAGE")) - toMonnaie(row.valeur("FACTURE"));
  vSolde_.set(solde < Monnaie() ? Monnaie() : solde);
  vPrestationEnCours_.set(ligne);
  Export::pour_tout(evt);
}

}  // namespace quarvo
