#include "quarvo/imputation/QUARVOImputer.h"

#include "host/Execute.h"
#include "host/session/Session.h"
#include "host/ui/Ecran.h"
#include "quarvo/frame/Appels.h"
#include "quarvo/frame/PieceKinds.h"

namespace quarvo {

using namespace host;
using frame::appeler;

namespace {

const char* const kBornes[] = {"BORNE1", "BORNE2", "BORNE3", "BORNE4",
                               "BORNE5", "BORNE6", "BORNE7"};

}  // namespace

QUARVOImputer::QUARVOImputer(Evt* evt)
    : Seletat(evt),
      vtypePiece_(chaine("VTYPE_PIECE", "Pièces", "T")),
      vnummin_(chaine("VNUMMIN", "Du numéro")),
      vnummax_(chaine("VNUMMAX", "Au numéro")),
      vexplications_(chaine("VEXPLICATIONS")),
      vpiece_(chaine("VPIECE", "Pièce")),
      mo_(chaine("MO")),
      an_(chaine("AN")),
      vDateFin_(date("V_DATE_FIN")),
      vPointer_(chaine("V_POINTER")),
      vOngletPrecedent_(chaine("V_ONGLETPRECEDENT")),
      vEComposant_(chaine("V_ECOMPOSANT")),
      vZumdev_(chaine("V_ZUMDEV")),
      vChoix_(chaine("V_CHOIX")),
      eappr_(this, "VOVOVA", "M_EAPPR", ""),
      erreurs_(this, "VOVOVA", "IMM_ERREUR", "") {
  nomBase("VOVOVA");
  nomEcran("IMPUTER");
  addBranch("INIT", [this](Evt* e) { init(e); });
  addBranch("AVANT_DEBUT", [this](Evt* e) { avant_debut(e); });
  addBranch("DEBUT", [this](Evt* e) { debut(e); });
  addBranch("DEBUT_ACTIVATION", [this](Evt* e) { debut_activation(e); });
  addBranch("BORNE(1,7)", [this](Evt* e) { borne__1__7(e); });
  addBranch("VDATEMIN", [this](Evt* e) { vdatemin(e); });
  addBranch("VDATEMAX", [this](Evt* e) { vdatemax(e); });
  addBranch("VNUMMIN", [this](Evt* e) { vnummin(e); });
  addBranch("VNUMMAX", [this](Evt* e) { vnummax(e); });
  addBranch("VAFFA_TOUTES", [this](Evt* e) { vaffa_toutes(e); });
  addBranch("VAFFA_CODE_CHOISIR", [this](Evt* e) { vaffa_code_choisir(e); });
  addBranch("RECULER", [this](Evt* e) { reculer(e); });
  addBranch("AVANCER", [this](Evt* e) { avancer(e); });
  addBranch("P1", [this](Evt* e) { p1(e); });
  addBranch("P2", [this](Evt* e) { p2(e); });
  addBranch("P3", [this](Evt* e) { p3(e); });
  addBranch("LST_LISTE_VIDE", [this](Evt* e) { lst_liste_vide(e); });
  addBranch("LST_LISTE_PLEINE", [this](Evt* e) { lst_liste_pleine(e); });
  addBranch("LST_SELECTION", [this](Evt* e) { lst_selection(e); });
  addBranch("LST_C5", [this](Evt* e) { lst_c5(e); });
  addBranch("VALIDATION", [this](Evt* e) { validation(e); });
  addBranch("APRES_VALIDATION", [this](Evt* e) { apres_validation(e); });
  addBranch("ABAND", [this](Evt* e) { aband(e); });
  addBranch("SORTIE_ECRAN", [this](Evt* e) { sortie_ecran(e); });
  addBranch("TERMINE", [this](Evt* e) { termine(e); });
  addBranch("DEPOINTER_PIECES", [this](Evt* e) { depointer_pieces(e); });
  addBranch("POINTER_PIECES", [this](Evt* e) { pointer_pieces(e); });
  addBranch("GERER_IMPUTATION", [this](Evt* e) { gerer_imputation(e); });
  addBranch("EXPORTER_LISTE_CSV", [this](Evt* e) { exporter_liste_csv(e); });
}

int QUARVOImputer::executer(const std::string& label) {
  EvtParamVal none;
  appelerProcedure("", "", "", label, &none, 0);
  return erreurMethode();
}

void QUARVOImputer::message(const std::string& number) {
  frame::messageOk(*this, vChoix_, number);
}

void QUARVOImputer::init(Evt* evt) {
  Seletat::init(evt);
}

void QUARVOImputer::avant_debut(Evt* evt) {
  Seletat::avant_debut(evt);
  for (const char* c : {"RECULER", "VALID", "TERMINE"}) interdire(c);
  // Tabs move with "AVANCER" and "RECULER" only: the pointing is never skipped.
  interdire("ONGLET");
  listeSur("LST", eappr_);
  listeSur("LST_ERREUR", erreurs_);
}

void QUARVOImputer::debut(Evt* evt) {
  Seletat::debut(evt);
  // The work tables are the session's: the cancellation selection would share them.
  for (Automate* w : session().fenetresModales()) {
    if (w->nomAutomate() == "QUARVO-ANNULER") {
      frame::messageOk(*this, vChoix_, "19", {"d'annulation des imputations"});
      sortir();
      return;
    }
  }
  if (appeler(*this, "AFSOCI", "LECTURE_CODE", {val("SOCIETE")}) != 0) {
    message("14");
    sortir();
    return;
  }
  std::string mois = Execute::execute(*this, "I_AFSOCI.MOIS_ANNEE").value_or(Valeur()).toChaine();
  mo_.set(mois.size() >= 2 ? mois.substr(0, 2) : "");
  an_.set(mois.size() >= 6 ? mois.substr(2, 4) : "");
  auto premier = Date::parse("01/" + mo_.text() + "/" + an_.text());
  vDateFin_.set(premier ? premier->lastOfMonth() : Date());
  vdatemin_.set(Date());
  vdatemax_.set(vDateFin_.date());
  appeler(*this, "SYSASCII", "CONVERSION_CHEMIN", {val("[zumdev]"), ref(vZumdev_)});
  bool option8 = Execute::execute(*this, "I_AFSOCI.OPTION8").value_or(Valeur()).toChaine() == "O";
  vexplications_.set(vZumdev_.text() + "DOVERUVA/FICSTAND/" +
                     (option8 ? "MEMO1B.TXT" : "MEMO1.TXT"));
  onglets("P1");
}

void QUARVOImputer::debut_activation(Evt*) {
  afficherListe("LST");
  afficherListe("LST_ERREUR");
}

void QUARVOImputer::vdatemin(Evt*) {}

void QUARVOImputer::vdatemax(Evt* evt) {
  if (vdatemax_.date().empty()) {
    message("65");
    controler("VDATEMAX");
    rejeter(evt);
  }
}

void QUARVOImputer::vnummin(Evt*) {}
void QUARVOImputer::vnummax(Evt*) {}

void QUARVOImputer::vaffa_toutes(Evt* evt) {
  Seletat::vaffa_toutes(evt);
}

void QUARVOImputer::vaffa_code_choisir(Evt* evt) {
  Seletat::vaffa_code_choisir(evt);
}

void QUARVOImputer::onglets(const std::string& tab) {
  bool p1 = tab == "P1";
  for (const char* b : kBornes) p1 ? autoriser(b) : interdire(b);
  for (const char* c : {"VDATEMIN", "VDATEMAX"}) p1 ? autoriser(c) : interdire(c);
  if (tab == "P1") {
    autoriser("AVANCER");
    for (const char* c : {"RECULER", "VALID", "TERMINE"}) interdire(c);
  } else if (tab == "P2") {
    for (const char* c : {"RECULER", "AVANCER", "VALID"}) autoriser(c);
    interdire("TERMINE");
  } else {
    autoriser("RECULER");
    for (const char* c : {"AVANCER", "VALID", "TERMINE"}) interdire(c);
  }
  vOngletPrecedent_.set(tab);
}

void QUARVOImputer::reculer(Evt* evt) {
  std::string tab = ecran().onglet();
  std::string cible = tab == "P2" ? "P1" : tab == "P3" ? "P2" : "";
  if (!cible.empty() && !demanderOnglet(cible)) rejeter(evt);
}

void QUARVOImputer::avancer(Evt* evt) {
  std::string tab = ecran().onglet();
  std::string cible = tab == "P1" ? "P2" : tab == "P2" ? "P3" : "";
  if (!cible.empty() && !demanderOnglet(cible)) rejeter(evt);
}

void QUARVOImputer::p1(Evt*) {
  onglets("P1");
}

void QUARVOImputer::p2(Evt* evt) {
  if (vOngletPrecedent_.text() != "P3") {
    if (vaffaToutes_.text() == "U" && vaffaCode_.text().empty()) {
      message("438");
      controler("VAFFA_TOUTES");
      rejeter(evt);
      return;
    }
    if (!frame::messageOn(*this, vChoix_, "431")) {
      rejeter(evt);
      return;
    }
    executer("DEPOINTER_PIECES");
    executer("POINTER_PIECES");
  }
  onglets("P2");
  afficherListe("LST");
  afficherListe("LST_ERREUR");
}

void QUARVOImputer::p3(Evt*) {
  onglets("P3");
}

void QUARVOImputer::lst_liste_vide(Evt*) {
  interdire("GERER_IMPUTATION");
}

void QUARVOImputer::lst_liste_pleine(Evt*) {
  autoriser("GERER_IMPUTATION");
}

void QUARVOImputer::lst_selection(Evt*) {
  vEComposant_.assign(eappr_.valeur("COMPOSANT"));
  std::string composant = vEComposant_.text();
  std::string piece = eappr_.valeur("PIECE").toChaine();
  if (appeler(*this, composant, "LECTURE", {eappr_.valeur("COMPOSANT_IDENT")}) != 0) return;
  std::string type = Execute::execute(*this, "I_GAPEFAC.TYPE").value_or(Valeur()).toChaine();
  vpiece_.set(frame::legendePiece(composant, piece, type));
  appeler(*this, "GCPFOUR", "LECTURE",
          {Execute::execute(*this, "I_" + composant + ".GCPFOUR_IDENT").value_or(Valeur())});
}

void QUARVOImputer::lst_c5(Evt* evt) {
  std::string flag = eappr_.valeur("IMPUTATION").toChaine();
  if (flag != "O" && flag != "N") {
    controler("LST_C5");
    rejeter(evt);
    return;
  }
  if (flag == "O" && toEntier(eappr_.valeur("ERREUR")) != 0) {
    message("118");
    eappr_.ecrire("IMPUTATION", Valeur::chaine("N"));
  }
  eappr_.modifier();
}

void QUARVOImputer::validation(Evt* evt) {
  if (!frame::messageOn(*this, vChoix_, "119")) {
    controler("VALID");
    rejeter(evt);
    return;
  }
  for (const char* c :
       {"LST", "GERER_IMPUTATION", "RECULER", "AVANCER", "ABAND", "VALID", "TERMINE"}) {
    interdire(c);
  }
  appelerModule("", "QUARVO", "QUARVO-IMPUTER_PIECES", nullptr);
  afficherListe("LST");
  autoriser("TERMINE");
}

void QUARVOImputer::apres_validation(Evt*) {}

void QUARVOImputer::aband(Evt* evt) {
  sortie_ecran(evt);
}

void QUARVOImputer::sortie_ecran(Evt*) {
  executer("TERMINE");
  sortir();
}

void QUARVOImputer::termine(Evt*) {
  viderTables();
  sortir(nullptr, 0);
}

void QUARVOImputer::fermer() {
  executer("SORTIE_ECRAN");
}

void QUARVOImputer::viderTables() {
  erreurs_.supprimerTout();
  for (const char* t : {"M_EAPPR", "M_LAPPR", "M_VAPPR"}) {
    Table table(this, "VOVOVA", t, "VIDER");
    table.supprimerTout();
  }
  vPointer_.set("N");
}

void QUARVOImputer::depointer_pieces(Evt*) {
  if (vPointer_.text() == "N") return;
  viderTables();
}

void QUARVOImputer::pointer_pieces(Evt*) {
  if (vPointer_.text() == "O") return;
  EvtParamRef pointage{ref(vdatemin_), ref(vdatemax_), ref(vtypePiece_), val(""),
                       ref(vnummin_),  ref(vnummax_),  ref(vaffaCode_)};
  appelerModule("", "QUARVO", "QUARVO-POINTER_PIECES", &pointage);
  vPointer_.set("O");
}

void QUARVOImputer::gerer_imputation(Evt*) {
  EvtParamVal piece{eappr_.valeur("IDENT")};
  lancerModule("", "QUARVO", "QUARVO-IMPUTER1", &piece);
}

void QUARVOImputer::exporter_liste_csv(Evt* evt) {
  EvtParamVal liste{val("LST_ERREUR")};
  Seletat::exporter_liste_csv(&liste);
  erreurMethode(liste.erreur(), evt);
}

}  // namespace quarvo
