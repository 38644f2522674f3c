#include "quarvo/analysis/QUARVOAnnuler1.h"

#include "host/session/Session.h"
#include "host/table/Database.h"
#include "quarvo/frame/Appels.h"

namespace quarvo {

using namespace host;
using frame::appeler;

QUARVOAnnuler1::QUARVOAnnuler1(Evt* evt)
    : Traitmnt(evt),
      composant_(chaine("PCOMPOSANT")),
      composantIdent_(chaine("PCOMPOSANT_IDENT")),
      vChoix_(chaine("V_CHOIX")),
      quarvo_(this, "VOVOVA", "QUARVO", ""),
      aflbud_(this, "VOVOVA", "I_AFLBUD", ""),
      cComposant_("COMPOSANT", quarvo_),
      cComposantIdent_("COMPOSANT_IDENT", quarvo_),
      cAfaffaIdent_("AFAFFA_IDENT", quarvo_),
      cAflbudIdent_("AFLBUD_IDENT", quarvo_),
      cIdent_("IDENT", quarvo_),
      cAfpresIdent_("AFPRES_IDENT", aflbud_) {
  lierParametres(evt, {{&composant_, 0}, {&composantIdent_, 0}});
  nomBase("VOVOVA");
  addBranch("DEBUT", [this](Evt* e) { debut(e); });
  addBranch("FAIRE", [this](Evt* e) { faire(e); });
  addBranch("ANNULER_QUARVO", [this](Evt* e) { annuler_quarvo(e); });
  addBranch("SUPPRESSION_MAJ_LIENS", [this](Evt* e) { suppression_maj_liens(e); });
  addBranch("MAJ_LIENS", [this](Evt* e) { maj_liens(e); });
}

void QUARVOAnnuler1::debut(Evt* evt) {
  if (appeler(*this, "AFSOCI", "LECTURE_CODE", {val("SOCIETE")}) != 0) {
    frame::messageOk(*this, vChoix_, "14");
    erreurMethode(1, evt);
    sortir();
  }
}

void QUARVOAnnuler1::faire(Evt* evt) {
  Transaction tx(session().db());
  quarvo_.effacerCriteres();
  quarvo_.ajouterCritere(cComposant_.name(), '=', composant_.value(), 'D');
  quarvo_.ajouterCritere(cComposantIdent_.name(), '=', composantIdent_.value(), 'D');
  quarvo_.verrouiller('E');
  quarvo_.ouvrir();
  while (quarvo_.lire(1) == 0) {
    appelerProcedure("", "", "", "ANNULER_QUARVO", evt, 0);
    appelerProcedure("", "", "", "SUPPRESSION_MAJ_LIENS", evt, 0);
    // The cursor keeps the deleted row's values for the recompute that follows.
    quarvo_.supprimer('N');
    appelerProcedure("", "", "", "MAJ_LIENS", evt, 0);
  }
  tx.commit();
  erreurMethode(0, evt);
}

void QUARVOAnnuler1::annuler_quarvo(Evt* evt) {
  erreurMethode(0, evt);
  bool ok = appeler(*this, "AFAFFA", "LECTURE", {cAfaffaIdent_.valeur()}) == 0 &&
            appeler(*this, "AFLBUD", "LECTURE", {cAflbudIdent_.valeur()}) == 0 &&
            appeler(*this, "AFPRES", "LECTURE", {cAfpresIdent_.valeur()}) == 0;
  erreurMethode(ok ? 0 : 1, evt);
}

void QUARVOAnnuler1::suppression_maj_liens(Evt* evt) {
  appeler(*this, "QUARVO", "SUPPRESSION_MAJ",
          {cAflbudIdent_.valeur(), cComposant_.valeur(), cComposantIdent_.valeur()});
  appeler(*this, "AFPFST", "PURGER_QUARVO", {cIdent_.valeur()});
  erreurMethode(0, evt);
}

void QUARVOAnnuler1::maj_liens(Evt* evt) {
  appeler(*this, "QUARVO", "VALIDATION_MAJ",
          {cAflbudIdent_.valeur(), cComposant_.valeur(), cComposantIdent_.valeur()});
  erreurMethode(0, evt);
}

}  // namespace quarvo
