#include "suite/Afpfst.h"

#include "host/session/Session.h"
#include "host/table/Database.h"
#include "host/table/Table.h"

namespace quarvo::suite {

using namespace host;

Afpfst::Afpfst(Evt* evt) : Interface2(evt) {
  addBranch("PURGER_QUARVO", [this](Evt* e) {
    Table pointing(this, nomBase(), "AFPFST", "POINTAGE");
    pointing.effacerCriteres();
    pointing.ajouterCritere("QUARVO_IDENT", '=', e->valeur(0));
    pointing.supprimerTout();
    erreurMethode(0, e);
  });
  addBranch("GESTION", [this](Evt* e) { gestion(e); });
}

void Afpfst::gestion(Evt* evt) {
  Valeur lien = evt->valeur(0);
  Table link(this, nomBase(), "QUARVO", "POINTAGE");
  if (lien.toChaine().empty() || link.chercher(3, "IDENT", '=', lien) != 0) {
    erreurMethode(1, evt);
    return;
  }
  Table pointing(this, nomBase(), "AFPFST", "POINTAGE");
  bool creer = evt->valeur(1).toChaine().find('C') != std::string::npos;
  if (!creer || pointing.chercher(3, "QUARVO_IDENT", '=', lien) == 0) {
    erreurMethode(0, evt);
    return;
  }
  Transaction tx(session().db());
  Field& ident = chaine("P_IDENT");
  EvtParamRef numbering{val("VOVOVA"), val("NUMEROS"), val("AFPFST"), val(""), val(10), ref(ident)};
  if (session().appelerProcedure("ZUMNDOC", "ATTRIBUE_NUMERO", &numbering) != 0) {
    erreurMethode(1, evt);
    return;
  }
  pointing.preparer();
  pointing.ecrire("IDENT", ident.value());
  pointing.ecrire("QUARVO_IDENT", lien);
  pointing.ecrire("DATE_POINTAGE", link.valeur("DATE_PIECE"));
  pointing.ecrire("QTE", link.valeur("QTE"));
  pointing.ecrire("HT", link.valeur("HT"));
  if (pointing.inserer() != 0) {
    erreurMethode(1, evt);
    return;
  }
  tx.commit();
  erreurMethode(0, evt);
}

}  // namespace quarvo::suite
