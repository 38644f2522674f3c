#include "quarvo/links/QUARVOExiste_chainage_aval.h"

#include "quarvo/frame/Keys.h"

namespace quarvo {

using namespace host;

QUARVOExiste_chainage_aval::QUARVOExiste_chainage_aval(Evt* evt)
    : Traitmnt(evt),
      type_(entier("TYPE")),
      ident_(chaine("IDENT")),
      typeCible_(entier("TYPE_CIBLE")),
      identCible_(chaine("IDENT_CIBLE")),
      chainage_(this, "GESCOM", "CHAINAGE", "CTX_CHAINAGE"),
      cleSrc_("CLE_SRC", chainage_),
      typeDst_("TYPE_DST", chainage_),
      ideDst_("IDE_DST", chainage_) {
  lierParametres(evt, {{&type_, 0}, {&ident_, 0}, {&typeCible_, 1}, {&identCible_, 1}});
  nomBase("VOVOVA");
  addBranch("FAIRE", [this](Evt* e) { faire(e); });
}

void QUARVOExiste_chainage_aval::faire(Evt* evt) {
  std::string key = frame::cleChainageSource(type_.entier(), ident_.text());
  chainage_.effacerCriteres();
  chainage_.ajouterCritere(cleSrc_.name(), '/', Valeur::chaine(key), 'R');
  chainage_.ouvrir();
  if (chainage_.lire(4, 'A') == 0) {
    typeCible_.assign(typeDst_.valeur());
    identCible_.assign(ideDst_.valeur());
    erreurMethode(0, evt);
  } else {
    typeCible_.set(int64_t{0});
    identCible_.set("");
    erreurMethode(1, evt);
  }
  sortir(nullptr, 0);
}

}  // namespace quarvo
