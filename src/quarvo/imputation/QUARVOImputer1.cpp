#include "quarvo/imputation/QUARVOImputer1.h"

#include <cmath>

#include "host/Execute.h"
#include "host/ui/Ecran.h"
#include "quarvo/frame/Appels.h"

namespace quarvo {

using namespace host;
using frame::appeler;

namespace {

// Quantities typed as decimals add up within this: 0.6 + 0.3 + 0.1 is 1.
constexpr double kTolerance = 1e-6;

bool egales(double a, double b) {
  return std::fabs(a - b) <= kTolerance;
}

}  // namespace

QUARVOImputer1::QUARVOImputer1(Evt* evt)
    : Gestion_document(evt),
      pIdent_(chaine("P_IDENT")),
      vDesig_(chaine("V_DESIG", "Ligne budgétaire")),
      vTotQte_(dbl("V_TOT_QTE", "Quantité répartie")),
      i_(entier("I")),
      vLibel_(chaine("V_LIBEL")),
      vLibelle_(chaine("V_LIBELLE")),
      vChoix_(chaine("V_CHOIX")),
      lappr_(this, "VOVOVA", "M_LAPPR", ""),
      vappr_(this, "VOVOVA", "M_VAPPR", ""),
      vappr2_(this, "VOVOVA", "M_VAPPR", "M_VAPPR2") {
  lierParametres(evt, {{&pIdent_, 0}});
  nomBase("VOVOVA");
  nomEcran("IMPUTER1");
  modeSaisie("VMm");
  nomTable("M_EAPPR");
  entetePar("IDENT", pIdent_, lappr_);
  lappr_.effacerCriteres();
  lappr_.ajouterCritere("NUMERO", '/', Valeur::chaine(pIdent_.text() + "|"));
  addBranch("DEBUT_FICHE", [this](Evt* e) { debut_fiche(e); });
  addBranch("LST_LISTE_PLEINE", [this](Evt* e) { lst_liste_pleine(e); });
  addBranch("DEBUT_FICHE_LIGNE", [this](Evt* e) { debut_fiche_ligne(e); });
  addBranch("ACTIVE_REQUETE_LSTV", [this](Evt* e) { active_requete_lstv(e); });
  addBranch("CTRL_CREE_LIGNE", [this](Evt* e) { ctrl_cree_ligne(e); });
  addBranch("VALIDATION", [this](Evt* e) { validation(e); });
  addBranch("APRES_ABANDON", [this](Evt* e) { apres_abandon(e); });
  addBranch("CONTROLE_LIGNE", [this](Evt* e) { controle_ligne(e); });
  addBranch("VALIDATION_PIECE", [this](Evt* e) { validation_piece(e); });
  addBranch("ABANDON_PIECE", [this](Evt* e) { abandon_piece(e); });
  addBranch("LSTV_SELECTION", [this](Evt* e) { lstv_selection(e); });
  addBranch("LSTV_C5", [this](Evt* e) { lstv_c5(e); });
  addBranch("CALCUL_TOTAL_LIGNE", [this](Evt* e) { calcul_total_ligne(e); });
}

int QUARVOImputer1::executer(const std::string& label) {
  EvtParamVal none;
  appelerProcedure("", "", "", label, &none, 0);
  return erreurMethode();
}

std::string QUARVOImputer1::cleAllocations() {
  return lignes().valeur("COMPOSANT").toChaine() + "|" +
         lignes().valeur("COMPOSANT_IDENT").toChaine();
}

void QUARVOImputer1::debut_fiche(Evt*) {
  std::string composant = entete().valeur("COMPOSANT").toChaine();
  std::string label = "559";
  if (composant == "GAPEBL") label = "560";
  if (composant == "GAPEFAC") {
    bool facture =
        appeler(*this, "GAPEFAC", "LECTURE", {entete().valeur("COMPOSANT_IDENT")}) == 0 &&
        Execute::execute(*this, "I_GAPEFAC.TYPE").value_or(Valeur()).toChaine() == "F";
    label = facture ? "561" : "562";
  }
  appeler(*this, "COMMUN", "LIRE_LIBEL", {val(label), ref(vLibel_)});
  std::string texte = vLibel_.text();
  size_t marque = texte.find("$1");
  i_.set(static_cast<int64_t>(marque == std::string::npos ? texte.size() : marque));
  vLibelle_.set(texte.substr(0, static_cast<size_t>(i_.entier())) +
                entete().valeur("PIECE").toChaine());
  titre(vLibelle_.text());
  listeSur("LSTV", vappr_);
}

void QUARVOImputer1::lst_liste_pleine(Evt*) {
  for (const char* b : {"CREE_LIGNE", "SUPPR_LIGNE", "MONTE_LIGNE", "DESCEND_LIGNE"}) interdire(b);
}

void QUARVOImputer1::debut_fiche_ligne(Evt*) {
  executer("ACTIVE_REQUETE_LSTV");
}

void QUARVOImputer1::active_requete_lstv(Evt*) {
  vappr_.effacerCriteres();
  vappr_.ajouterCritere("IDENT", '=', Valeur::chaine(cleAllocations()));
  afficherListe("LSTV");
  executer("CALCUL_TOTAL_LIGNE");
}

void QUARVOImputer1::ctrl_cree_ligne(Evt*) {
  // A pointed piece's lines are its own: none is added here.
}

void QUARVOImputer1::calcul_total_ligne(Evt*) {
  double total = 0;
  vappr2_.effacerCriteres();
  vappr2_.ajouterCritere("IDENT", '=', Valeur::chaine(cleAllocations()));
  vappr2_.ouvrir();
  while (vappr2_.lire(1) == 0) total += toDouble(vappr2_.valeur("QTE"));
  // Shown as typed: 0.6 + 0.3 + 0.1 reads 1, not a binary neighbour of it.
  vTotQte_.set(valeurArrondie(total, 6, '='));
}

void QUARVOImputer1::lstv_c5(Evt* evt) {
  // The allocation just typed: all of one line's allocations go the line's way.
  double qte = toDouble(vappr_.valeur("QTE"));
  double ligne = toDouble(lignes().valeur("QTE"));
  if ((ligne > 0 && qte < 0) || (ligne < 0 && qte > 0)) {
    BoiteDialogue("Attention",
                  "Une répartition doit être du signe de la quantité de la ligne (" +
                      lignes().valeur("QTE").toChaine() + ").",
                  0, {"$1~OK"});
    controler("LSTV_C5");
    rejeter(evt);
    return;
  }
  Monnaie puht = toMonnaie(lignes().valeur("PUHT"));
  vappr_.ecrire("HT", Valeur::monnaie(valeurArrondie(puht * Monnaie::fromDouble(qte), 2, '=')));
  double qtt = ligne != 0 ? toDouble(lignes().valeur("QTT")) / ligne * qte : 0.0;
  vappr_.ecrire("QTT", Valeur::dbl(qtt));
  vappr_.modifier();
  executer("CALCUL_TOTAL_LIGNE");
}

void QUARVOImputer1::lstv_selection(Evt*) {
  appeler(*this, "AFAFFA", "LECTURE", {vappr_.valeur("AFAFFA_IDENT")});
  appeler(*this, "AFCLIE", "LECTURE",
          {Execute::execute(*this, "I_AFAFFA.AFCLIE_IDENT").value_or(Valeur())});
  appeler(*this, "AFEBUD", "LECTURE", {vappr_.valeur("AFEBUD_IDENT")});
  appeler(*this, "AFLBUD", "LECTURE", {vappr_.valeur("AFLBUD_IDENT")});
  appeler(*this, "AFPRES", "LECTURE",
          {Execute::execute(*this, "I_AFLBUD.AFPRES_IDENT").value_or(Valeur())});
  std::string chapitre =
      Execute::execute(*this, "I_AFLBUD.CHAPITRE2").value_or(Valeur()).toChaine();
  std::string desig;
  if (!chapitre.empty()) desig = chapitre + (chapitre.back() == ')' ? " " : ") ");
  desig += Execute::execute(*this, "I_AFLBUD.DESIG").value_or(Valeur()).toChaine();
  vDesig_.set(desig);
}

void QUARVOImputer1::controle_ligne(Evt* evt) {
  erreurMethode(0, evt);
  executer("CALCUL_TOTAL_LIGNE");
  if (!egales(vTotQte_.dbl(), toDouble(lignes().valeur("QTE")))) {
    frame::messageOk(*this, vChoix_, "116");
    erreurMethode(1, evt);
  }
}

void QUARVOImputer1::validation(Evt* evt) {
  if (executer("CONTROLE_LIGNE") != 0) {
    controler("LSTV");
    rejeter(evt);
    return;
  }
  executer("VALIDATION_PIECE");
}

void QUARVOImputer1::validation_piece(Evt*) {
  int64_t erreur = 0;
  pourChaqueLigne([this, &erreur](Table& lignes, const std::string& cle) {
    double somme = 0;
    vappr2_.effacerCriteres();
    vappr2_.ajouterCritere("IDENT", '=', Valeur::chaine(cle));
    vappr2_.ouvrir();
    while (vappr2_.lire(1) == 0) {
      somme += toDouble(vappr2_.valeur("QTE"));
      vappr2_.ecrire("QTE0", vappr2_.valeur("QTE"));
      vappr2_.modifier();
    }
    bool juste = egales(somme, toDouble(lignes.valeur("QTE")));
    lignes.ecrire("ERREUR", Valeur::entier(juste ? 0 : 1));
    lignes.modifier();
    if (!juste) erreur = 1;
  });
  entete().ecrire("ERREUR", Valeur::entier(erreur));
  if (erreur != 0) {
    // As the message says: a piece left unbalanced is not imputed.
    entete().ecrire("IMPUTATION", Valeur::chaine("N"));
    frame::messageOk(*this, vChoix_, "117");
  }
  afficherListe("LSTV");
}

void QUARVOImputer1::pourChaqueLigne(
    const std::function<void(Table& ligne, const std::string& cle)>& faire) {
  Table lignes(this, "VOVOVA", "M_LAPPR", "LIGNES_PIECE");
  lignes.effacerCriteres();
  lignes.ajouterCritere("NUMERO", '/', Valeur::chaine(pIdent_.text() + "|"));
  lignes.ouvrir();
  while (lignes.lire(1) == 0) {
    faire(lignes, lignes.valeur("COMPOSANT").toChaine() + "|" +
                      lignes.valeur("COMPOSANT_IDENT").toChaine());
  }
}

void QUARVOImputer1::abandon_piece(Evt*) {
  pourChaqueLigne([this](Table& lignes, const std::string& cle) {
    Monnaie puht = toMonnaie(lignes.valeur("PUHT"));
    double qteLigne = toDouble(lignes.valeur("QTE"));
    double qttLigne = toDouble(lignes.valeur("QTT"));
    vappr2_.effacerCriteres();
    vappr2_.ajouterCritere("IDENT", '=', Valeur::chaine(cle));
    vappr2_.ouvrir();
    while (vappr2_.lire(1) == 0) {
      double qte0 = toDouble(vappr2_.valeur("QTE0"));
      vappr2_.ecrire("QTE", Valeur::dbl(qte0));
      vappr2_.ecrire("HT",
                     Valeur::monnaie(valeurArrondie(puht * Monnaie::fromDouble(qte0), 2, '=')));
      // The processed quantity follows the quantity put back, as when it was typed.
      vappr2_.ecrire("QTT", Valeur::dbl(qteLigne != 0 ? qttLigne / qteLigne * qte0 : 0.0));
      vappr2_.modifier();
    }
  });
  if (ecran().trouverListe("LSTV") != nullptr) afficherListe("LSTV");
}

void QUARVOImputer1::apres_abandon(Evt*) {
  executer("ABANDON_PIECE");
}

}  // namespace quarvo
