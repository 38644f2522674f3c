#include "host/automate/Gestion_doc.h"

#include <algorithm>
#include <set>

#include "host/session/Session.h"
#include "host/table/Database.h"
#include "host/ui/Ecran.h"

namespace quarvo::host {

namespace {

// The key column of every main table a document works on.
constexpr const char* kCle = "IDENT";

const char* nomFonction(char function) {
  switch (function) {
    case 'C':
      return "la création de lignes";
    case 'M':
      return "la modification de lignes";
    case 'A':
      return "la suppression de lignes";
    default:
      break;
  }
  return "la consultation";
}

}  // namespace

Gestion_doc::Gestion_doc(Evt* creating) : Fenetre_simple(creating) {
  addBranch("VISUALISATION", [this](Evt* e) { visualisation(e); });
  addBranch("AJOUTER_LIGNE", [this](Evt* e) { ajouter_ligne(e); });
  addBranch("VALID_DOC", [this](Evt* e) { valid_doc(e); });
  addBranch("ABAND_DOC", [this](Evt* e) { aband_doc(e); });
  addBranch("REDEMARRE", [this](Evt* e) { redemarre(e); });
  addBranch("CTRL_DEBUT_MODIF", [this](Evt* e) { ctrl_debut_modif(e); });
  addBranch("SAUVEGARDE", [this](Evt* e) { sauvegarde(e); });
}

Gestion_doc::~Gestion_doc() = default;

void Gestion_doc::lignesDe(const std::string& column, Field& value, const std::string& liste) {
  colonneCle_ = column;
  valeurCle_ = &value;
  liste_ = liste;
  memoire_ = "MEM:" + nomTable();
  ligne_ = std::make_unique<Table>(this, nomBase(), memoire_, "LIGNE_COURANTE");
}

bool Gestion_doc::permis(char function) const {
  return droits_.find(function) != std::string::npos;
}

bool Gestion_doc::ligneAffichee(Table&) {
  return true;
}

void Gestion_doc::executer(Evt* evt) {
  EvtParamVal none;
  Evt* e = evt != nullptr ? evt : &none;
  for (const char* label : {"INIT", "DEBUT_TRI"}) {
    if (termine()) return;
    raise(label, e);
  }
  if (termine()) return;
  charger();
  raise("DEBUT", e);
  if (termine()) return;
  rafraichir();
  // A document without lines starts a new one, as the runtime does, when lines may be made.
  if (!montrerPremiereLigne() && permis('C')) creerLigne();
  rafraichir();
}

bool Gestion_doc::montrerPremiereLigne() {
  if (!affichees_.empty()) {
    devenirCourante(0);
    return true;
  }
  EvtParamVal vide;
  raise("DEBUT_FICHE_VIDE", &vide);
  EvtParamVal liste;
  raise("LST_LISTE_VIDE", &liste);
  return false;
}

void Gestion_doc::charger() {
  Table memoire(this, nomBase(), memoire_, "CHARGEMENT");
  memoire.supprimerTout();
  Table source(this, nomBase(), nomTable(), "ORIGINE_DOCUMENT");
  source.effacerCriteres();
  source.ajouterCritere(colonneCle_, '=', valeurCle_->value());
  const auto& columns = source.store().schema().columns();
  while (source.lire(1) == 0) {
    memoire.preparer();
    for (const auto& c : columns) memoire.ecrire(c.name, source.valeur(c.name));
    memoire.inserer();
  }
  nouvelle_ = false;
  saisie_ = false;
  modifie_ = false;
  courante_ = 0;
  ecran().setMode("V");
  ecran().setNonEnregistre(false);
}

void Gestion_doc::rafraichir() {
  affichees_.clear();
  Table scan(this, nomBase(), memoire_, "AFFICHAGE");
  scan.effacerCriteres();
  scan.ouvrir();
  while (scan.lire(1) == 0) {
    if (ligneAffichee(scan)) affichees_.push_back(scan.courantId());
  }
  const DescListe* d = ecran().description().liste(liste_);
  if (d == nullptr) return;
  ListeEcran& l = ecran().liste(liste_);
  l.lignes.clear();
  l.courante = 0;
  RowId courant = nouvelle_ ? 0 : ligne_->courantId();
  auto cellules = [&d](Table& t) {
    std::vector<std::string> cells;
    for (const auto& c : d->colonnes) {
      cells.push_back(c.colonne.empty() ? std::string() : t.valeur(c.colonne).toChaine());
    }
    return cells;
  };
  for (size_t i = 0; i < affichees_.size(); ++i) {
    // The line being changed shows what was typed, not what the memory table still holds.
    if (saisie_ && affichees_[i] == courant) {
      l.lignes.push_back(cellules(*ligne_));
    } else {
      scan.aller(affichees_[i]);
      l.lignes.push_back(cellules(scan));
    }
    if (affichees_[i] == courant) l.courante = i + 1;
  }
  if (nouvelle_) {
    l.lignes.push_back(cellules(*ligne_));
    l.courante = l.lignes.size();
  }
  courante_ = nouvelle_ ? 0 : l.courante;
  ecran().setMode(std::string(1, mode()));
  ecran().setNonEnregistre(modifie_ || enSaisie());
}

void Gestion_doc::devenirCourante(size_t index) {
  if (index >= affichees_.size()) return;
  ligne_->aller(affichees_[index]);
  courante_ = index + 1;
  EvtParamVal e;
  raise("DEBUT_LIGNE", &e);  // a refusal here only keeps the person on the line
  EvtParamVal f;
  raise("AFFICHER_LIGNE", &f);
}

int Gestion_doc::demander(const std::string& type, const std::string& text,
                          const std::vector<std::string>& buttons) {
  Field reponse("REPONSE", "", "", 4, Kind::Entier, Valeur::entier(0), this);
  EvtParamRef e{val(type), ref(reponse)};
  if (hasBranch("DIALOGUE")) raise("DIALOGUE", &e);
  if (reponse.entier() >= 1 && static_cast<size_t>(reponse.entier()) <= buttons.size()) {
    return static_cast<int>(reponse.entier());
  }
  return BoiteDialogue("Question", text, 0, buttons);
}

bool Gestion_doc::validerLigne() {
  if (!enSaisie()) return true;
  if (!leverAction("VALIDATION")) return false;
  if (termine()) return false;
  bool creation = nouvelle_;
  if (creation) {
    if (ligne_->valeur(kCle).toChaine().empty() || ligne_->inserer() != 0) {
      BoiteDialogue("Attention", "La ligne n'a pas pu être ajoutée au document.", 0, {"$1~OK"});
      return false;
    }
    nouvelle_ = false;
  } else {
    ligne_->modifier();
  }
  saisie_ = false;
  modifie_ = true;
  EvtParamVal e;
  raise(creation ? "FIN_CREATION" : "FIN_MODIFICATION", &e);
  rafraichir();
  return true;
}

void Gestion_doc::abandonnerLigne() {
  if (nouvelle_) {
    nouvelle_ = false;
    // Back on the line that was current before the new one was started.
    if (avantCreation_ != 0) ligne_->aller(avantCreation_);
  } else if (saisie_ && ligne_->courantId() != 0) {
    ligne_->aller(ligne_->courantId());
  }
  saisie_ = false;
  rafraichir();
  // Back on a line as it was: the document shows it again (and what may be done on it).
  if (ligne_->courantId() != 0) {
    EvtParamVal e;
    raise("DEBUT_LIGNE", &e);
    EvtParamVal f;
    raise("AFFICHER_LIGNE", &f);
  }
}

void Gestion_doc::visualisation(Evt*) {
  abandonnerLigne();
  EvtParamVal e;
  raise("DEBUT_VISUALISATION", &e);
}

bool Gestion_doc::entrerModification(bool personne) {
  if (enSaisie()) return true;
  if (courante_ == 0 || ligne_->courantId() == 0) return false;
  if (!permis('M')) {
    BoiteDialogue("Attention", std::string("Ce document ne permet pas ") + nomFonction('M') + ".",
                  0, {"$1~OK"});
    return false;
  }
  if (personne && ecran().trouver("MODIFICATION") != nullptr &&
      !ecran().accessible("MODIFICATION")) {
    BoiteDialogue("Attention", "Cette ligne ne peut pas être modifiée.", 0, {"$1~OK"});
    return false;
  }
  saisie_ = true;
  if (!leverAction("DEBUT_MODIFICATION") || !leverAction("MODIFICATION")) {
    abandonnerLigne();
    return false;
  }
  rafraichir();
  return true;
}

bool Gestion_doc::creerLigne() {
  if (!permis('C')) {
    BoiteDialogue("Attention", std::string("Ce document ne permet pas ") + nomFonction('C') + ".",
                  0, {"$1~OK"});
    return false;
  }
  if (!validerLigne()) return false;
  avantCreation_ = ligne_->courantId();
  nouvelle_ = true;
  ligne_->preparer();
  if (!leverAction("DEBUT_CREATION") || (nouvelle_ && !leverAction("CREATION"))) {
    abandonnerLigne();
    return false;
  }
  rafraichir();
  return true;
}

bool Gestion_doc::choisirLigne(size_t row) {
  if (nouvelle_ && row == affichees_.size() + 1) return true;  // the line being entered
  if (row == 0 || row > affichees_.size()) return false;
  RowId voulue = affichees_[row - 1];
  if (saisie_ && ligne_->courantId() == voulue) return true;
  if (!validerLigne()) return false;
  auto it = std::find(affichees_.begin(), affichees_.end(), voulue);
  if (it == affichees_.end()) return false;
  devenirCourante(static_cast<size_t>(it - affichees_.begin()));
  rafraichir();
  return true;
}

bool Gestion_doc::saisirCellule(const std::string& list, size_t row, const std::string& column,
                                const std::string& text) {
  if (list != liste_) return Fenetre_simple::saisirCellule(list, row, column, text);
  const DescListe* d = ecran().description().liste(list);
  const DescColonne* colonne = nullptr;
  for (const auto& c : d->colonnes) {
    if (c.nom == column) colonne = &c;
  }
  if (colonne == nullptr) return false;
  bool nouvelleLigne = nouvelle_ && row == affichees_.size() + 1;
  if (!nouvelleLigne) {
    if (!choisirLigne(row) || !entrerModification(true)) return false;
  }
  Valeur ancienne;
  if (!colonne->colonne.empty()) {
    ancienne = ligne_->valeur(colonne->colonne);
    ligne_->ecrire(colonne->colonne, Valeur::chaine(text));
  }
  bool accepte = leverAction(column);
  if (!accepte && !colonne->colonne.empty() && enSaisie()) {
    ligne_->ecrire(colonne->colonne, ancienne);
  }
  if (!termine()) rafraichir();
  return accepte;
}

bool Gestion_doc::selectionnerLigne(const std::string& list, size_t row) {
  if (list != liste_) return Fenetre_simple::selectionnerLigne(list, row);
  return choisirLigne(row);
}

bool Gestion_doc::nouvelleLigne(const std::string& list) {
  if (list != liste_) return Fenetre_simple::nouvelleLigne(list);
  return creerLigne();
}

bool Gestion_doc::supprimerLigne(const std::string& list, size_t row) {
  if (list != liste_) return Fenetre_simple::supprimerLigne(list, row);
  if (nouvelle_ && row == affichees_.size() + 1) {
    abandonnerLigne();
    return true;
  }
  if (!permis('A')) {
    BoiteDialogue("Attention", std::string("Ce document ne permet pas ") + nomFonction('A') + ".",
                  0, {"$1~OK"});
    return false;
  }
  if (!choisirLigne(row)) return false;
  if (ecran().trouver("SUPPR") != nullptr && !ecran().accessible("SUPPR")) {
    BoiteDialogue("Attention", "Cette ligne ne peut pas être supprimée.", 0, {"$1~OK"});
    return false;
  }
  if (!leverAction("AVANT_SUPPRESSION")) return false;
  supprime_ = ligne_->valeur(kCle).toChaine();
  ligne_->supprimer();
  modifie_ = true;
  EvtParamVal e;
  raise("APRES_SUPPRESSION", &e);
  rafraichir();
  if (!affichees_.empty()) devenirCourante(0);
  rafraichir();
  return true;
}

bool Gestion_doc::presserBouton(const std::string& button) {
  bool accepte = true;
  if (button == "MODIFICATION") {
    accepte = entrerModification(true);
  } else if (button == "SUPPR") {
    accepte = courante_ != 0 && supprimerLigne(liste_, courante_);
  } else if (button == "B_VALID_LIGNE") {
    accepte = validerLigne();
  } else if (button == "B_ABAND_LIGNE") {
    abandonnerLigne();
  } else {
    accepte = Fenetre_simple::presserBouton(button);
  }
  if (!termine()) rafraichir();
  return accepte;
}

void Gestion_doc::ctrl_debut_modif(Evt*) {
  if (!enSaisie() && courante_ != 0) entrerModification(false);
}

void Gestion_doc::ajouter_ligne(Evt*) {
  // The buffer filled by the handler becomes a new line of the document.
  if (ligne_->valeur(kCle).toChaine().empty() || ligne_->inserer() != 0) return;
  nouvelle_ = false;
  saisie_ = false;
  modifie_ = true;
  rafraichir();
}

void Gestion_doc::valid_doc(Evt* evt) {
  if (!validerLigne()) {
    rejeter(evt);
    return;
  }
  std::string courant = ligne_->courantId() != 0 ? ligne_->valeur(kCle).toChaine() : "";
  {
    Transaction tx(session().db());
    EvtParamVal e;
    raise("SAUVEGARDE", &e);
    if (rejete() || e.erreur() != 0) {
      rejeter(evt);
      return;
    }
    tx.commit();
  }
  // What the database now holds, with what its own rules computed.
  charger();
  rafraichir();
  auto it = affichees_.begin();
  Table t(this, nomBase(), memoire_, "RETOUR");
  for (; it != affichees_.end(); ++it) {
    t.aller(*it);
    if (t.valeur(kCle).toChaine() == courant) break;
  }
  if (it != affichees_.end()) {
    devenirCourante(static_cast<size_t>(it - affichees_.begin()));
  } else {
    montrerPremiereLigne();
  }
  rafraichir();
}

void Gestion_doc::sauvegarde(Evt*) {
  Table memoire(this, nomBase(), memoire_, "SAUVEGARDE_MEM");
  Table base(this, nomBase(), nomTable(), "SAUVEGARDE_DOC");
  Table ecriture(this, nomBase(), nomTable(), "SAUVEGARDE_ECRITURE");
  const auto& columns = base.store().schema().columns();
  std::set<std::string> enBase;
  base.effacerCriteres();
  base.ajouterCritere(colonneCle_, '=', valeurCle_->value());
  while (base.lire(1) == 0) enBase.insert(base.valeur(kCle).toChaine());
  std::set<std::string> gardees;
  memoire.effacerCriteres();
  memoire.ouvrir();
  while (memoire.lire(1) == 0) {
    std::string ident = memoire.valeur(kCle).toChaine();
    gardees.insert(ident);
    if (ecriture.chercher(3, kCle, '=', Valeur::chaine(ident)) == 0) {
      bool change = false;
      for (const auto& c : columns) {
        Valeur v = memoire.valeur(c.name);
        if (v.toChaine() != ecriture.valeur(c.name).toChaine()) {
          ecriture.ecrire(c.name, v);
          change = true;
        }
      }
      if (change) ecriture.modifier();
    } else {
      ecriture.preparer();
      for (const auto& c : columns) ecriture.ecrire(c.name, memoire.valeur(c.name));
      if (ecriture.inserer() != 0) {
        throw UException("the line " + ident + " could not be written to " + nomTable());
      }
    }
  }
  for (const auto& ident : enBase) {
    if (gardees.count(ident) == 0 && ecriture.chercher(3, kCle, '=', Valeur::chaine(ident)) == 0) {
      ecriture.supprimer();
    }
  }
}

void Gestion_doc::aband_doc(Evt*) {
  abandonnerLigne();
  charger();
  rafraichir();
  montrerPremiereLigne();
  rafraichir();
}

void Gestion_doc::redemarre(Evt* evt) {
  ++redemarrages_;
  abandonnerLigne();
  charger();
  EvtParamVal none;
  raise("DEBUT", evt != nullptr ? evt : &none);
  rafraichir();
  montrerPremiereLigne();
  rafraichir();
}

void Gestion_doc::fermer() {
  quitter();
}

bool Gestion_doc::quitter() {
  if (enSaisie() || modifie_) {
    int r = demander("VOULEZ_VOUS_SAUVER", "Enregistrer les modifications du document ?",
                     {"$1~Oui", "$2~Non", "$3~Annuler"});
    if (r == 1) {
      EvtParamVal e;
      raise("VALID_DOC", &e);
      if (modifie_ || enSaisie()) return false;  // the save was refused: stay
    } else if (r == 2) {
      abandonnerLigne();
      modifie_ = false;
    } else {
      return false;
    }
  }
  EvtParamVal e;
  int redemarrages = redemarrages_;
  raise("AVANT_SORTIE", &e);
  if (termine()) return true;
  if (redemarrages_ != redemarrages) return false;  // restarted by the handler: it stays
  if (rejete() || e.erreur() != 0) {
    redemarre(nullptr);
    return false;
  }
  sortir();
  return true;
}

}  // namespace quarvo::host
