#include "host/automate/Gestion_document.h"

#include "host/ui/Ecran.h"

namespace quarvo::host {

Gestion_document::Gestion_document(Evt* creating) : Fenetre_simple(creating) {}

void Gestion_document::entetePar(const std::string& column, Field& key, Table& lignes) {
  colonneCle_ = column;
  cle_ = &key;
  lignes_ = &lignes;
  entete_ = std::make_unique<Table>(this, nomBase(), nomTable(), "ENTETE_DOCUMENT");
}

void Gestion_document::titre(const std::string& text) {
  ecran().setTitre(text);
}

void Gestion_document::executer(Evt* evt) {
  EvtParamVal none;
  Evt* e = evt != nullptr ? evt : &none;
  for (const char* label : {"INIT", "AVANT_DEBUT", "DEBUT"}) {
    if (termine()) return;
    raise(label, e);
  }
  if (termine()) return;
  if (entete_->chercher(3, colonneCle_, '=', cle_->value()) != 0) {
    BoiteDialogue("Attention", "Le document " + cle_->text() + " est introuvable.", 0, {"$1~OK"});
    erreurMethode(1, e);
    sortir();
    return;
  }
  listeSur("LST", *lignes_);
  EvtParamVal fiche;
  raise("DEBUT_FICHE", &fiche);
  if (termine()) return;
  afficherLignes();
}

void Gestion_document::afficherLignes() {
  if (afficherListe("LST") > 0) {
    EvtParamVal e;
    raise("DEBUT_FICHE_LIGNE", &e);
  }
}

bool Gestion_document::selectionnerLigne(const std::string& list, size_t row) {
  bool accepte = Fenetre_simple::selectionnerLigne(list, row);
  if (accepte && list == "LST") {
    EvtParamVal e;
    raise("DEBUT_FICHE_LIGNE", &e);
  }
  return accepte;
}

bool Gestion_document::nouvelleLigne(const std::string& list) {
  if (list != "LST") return Fenetre_simple::nouvelleLigne(list);
  // The base makes no line: one is made only by a handler of "CTRL_CREE_LIGNE" that does.
  size_t avant = ecran().liste("LST").lignes.size();
  if (!leverAction("CTRL_CREE_LIGNE")) return false;
  afficherLignes();
  if (ecran().liste("LST").lignes.size() > avant) return true;
  BoiteDialogue("Attention", "Ce document ne permet pas d'ajouter des lignes.", 0, {"$1~OK"});
  return false;
}

bool Gestion_document::presserBouton(const std::string& button) {
  if (button == "VALID") {
    valider();
    return !rejete();
  }
  if (button == "ABANDON") {
    abandonner();
    return true;
  }
  return Fenetre_simple::presserBouton(button);
}

void Gestion_document::valider() {
  EvtParamVal e;
  raise("VALIDATION", &e);
  if (rejete() || termine()) return;
  // The header as the handlers left it, then the document closes.
  entete_->modifier();
  sortir();
}

void Gestion_document::abandonner() {
  EvtParamVal e;
  raise("APRES_ABANDON", &e);
  sortir();
}

void Gestion_document::fermer() {
  abandonner();
}

}  // namespace quarvo::host
