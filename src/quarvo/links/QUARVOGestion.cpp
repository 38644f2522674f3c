#include "quarvo/links/QUARVOGestion.h"

#include <cmath>

#include "host/session/Session.h"
#include "host/ui/Ecran.h"
#include "quarvo/frame/Appels.h"
#include "quarvo/frame/Apports.h"
#include "quarvo/frame/Keys.h"

namespace quarvo {

using namespace host;
using frame::appeler;

namespace {

// The labels of a budget's state.
std::string libelleEtat(const std::string& code) {
  if (code == "A") return "Anticipé";
  if (code == "E") return "En cours";
  if (code == "P") return "Facturé partiellement";
  if (code == "T") return "Facturé totalement";
  if (code == "C") return "Clôturé";
  return {};
}

// The chaining type code of a piece table.
int64_t typeDe(const std::string& composant) {
  if (composant == "GAPECOM") return -2;
  if (composant == "GAPEBL") return -3;
  if (composant == "GAPEFAC") return -4;
  return 0;
}

std::string composantDuType(int64_t type) {
  if (type == -2) return "GAPECOM";
  if (type == -3) return "GAPEBL";
  if (type == -4) return "GAPEFAC";
  return {};
}

const char* const kFonctionsPiece[] = {"CONSULTER_PIECE",     "VALIDER_PIECE", "TRANSFORMER_BR",
                                       "TRANSFORMER_FACTURE", "SOLDER_RAL",    "SOLDER_RAF"};
const char* const kTransformations[] = {"TRANSFORMER_BR", "TRANSFORMER_FACTURE", "SOLDER_RAL",
                                        "SOLDER_RAF"};

}  // namespace

QUARVOGestion::QUARVOGestion(Evt* evt)
    : Gestion_doc(evt),
      pident1_(chaine("PIDENT1", "Identifiant AFEBUD")),
      pident2_(chaine("PIDENT2", "Identifiant AFLBUD")),
      pmode_(chaine("PMODE")),
      vafebudHt_(monnaie("VAFEBUD_HT", "Total du budget")),
      vetat_(chaine("VETAT", "Code état du budget")),
      vetatPiece_(chaine("VETAT_PIECE", "Code état de la pièce")),
      vorigine_(chaine("VORIGINE", "Numéro de la pièce d'origine")),
      vtotGapecom_(monnaie("VTOT_GAPECOM", "Total des commandes")),
      vtotGapebl_(monnaie("VTOT_GAPEBL", "Total des BR")),
      vtotGapefac_(monnaie("VTOT_GAPEFAC", "Total des factures")),
      n_(entier("N")),
      m_(entier("M")),
      vmo_(chaine("VMO")),
      van_(chaine("VAN")),
      vanmo_(chaine("VANMO")),
      vdebmo_(date("VDEBMO")),
      vfinmo_(date("VFINMO")),
      vcompo_(chaine("VCOMPO", "Composant des pièces pointées")),
      vtypeCible_(entier("VTYPE_CIBLE", "Type de la pièce à intégrer")),
      videntCible_(chaine("VIDENT_CIBLE", "Identifiant de la pièce à intégrer")),
      verreur_(entier("VERREUR")),
      vtableVide_(entier("VTABLE_VIDE")),
      vdialogue_(entier("VDIALOGUE")),
      vpointerTemps_(entier("VPOINTER_TEMPS")),
      vdate_(date("VDATE")),
      vaflbudQte_(dbl("VAFLBUD_QTE")),
      vqte_(dbl("VQTE")),
      vqtt_(dbl("VQTT")),
      vht_(monnaie("VHT")),
      vvalidDoc_(chaine("VVALID_DOC", "", "N")),
      vtransformer_(chaine("VTRANSFORMER", "", "N")),
      vchoixPiece_(chaine("VCHOIX_PIECE", "", "N")),
      vpointerIdent_(chaine("VPOINTER_IDENT")),
      vctrlCode_(chaine("VCTRL_CODE")),
      vLibPiece_(chaine("V_LIB_PIECE")),
      vLibPiece1_(chaine("V_LIB_PIECE1")),
      vLibPiece2_(chaine("V_LIB_PIECE2")),
      vLibelle_(chaine("V_LIBELLE")),
      vLibel_(chaine("V_LIBEL")),
      vChoix_(chaine("V_CHOIX")),
      vCritereAchat_(chaine("V_CRITERE_ACHAT")),
      vPrestationIdent_(chaine("V_PRESTATION_IDENT")),
      vBudgetPiece_(chaine("VBUDGET", "Budget")),
      vLigneNumero_(chaine("VLIGNE", "Ligne budgétaire")),
      vLigneDesig_(chaine("VLIGNE_DESIG", "Désignation")),
      vAffaIdent_(chaine("VAFAFFA_IDENT")),
      vAffaCode_(chaine("VAFAFFA_CODE", "Affaire")),
      vPresIdent_(chaine("VAFPRES_IDENT")),
      vNature_(chaine("VNATURE")),
      vQbud_(dbl("VQBUD", "Quantité budgétée")),
      vCodeEtat_(chaine("VCODE_ETAT")),
      vLiaisonG_(chaine("VLIAISON_G")),
      vOption8_(chaine("VOPTION8")),
      origine_(this, "VOVOVA", "QUARVO", "TABLEORIGINE"),
      memoire_(this, "VOVOVA", "MEM:QUARVO", "QUARVO1"),
      liens_(this, "VOVOVA", "QUARVO", "QUARVO2"),
      aflbud_(this, "VOVOVA", "AFLBUD", ""),
      aflffo_(this, "VOVOVA", "AFLFFO", ""),
      afpers_(this, "VOVOVA", "AFPERS", ""),
      afpfst_(this, "VOVOVA", "AFPFST", "") {
  lierParametres(evt, {{&pident1_, 0}, {&pident2_, 0}, {&pmode_, 0}});
  nomBase("VOVOVA");
  nomEcran("GESTION");
  modeSaisie(pmode_.text());
  modes(pmode_.text());
  nomTable("QUARVO");
  lignesDe("AFLBUD_IDENT", pident2_);
  parametre(10);
  addBranch("DEBUT_TRI", [this](Evt* e) { debut_tri(e); });
  addBranch("DEBUT", [this](Evt* e) { debut(e); });
  addBranch("DEBUT_ACTIVATION", [this](Evt* e) { debut_activation(e); });
  addBranch("SELECTION", [this](Evt* e) { selection(e); });
  addBranch("LST_LISTE_VIDE", [this](Evt* e) { lst_liste_vide(e); });
  addBranch("AFFICHER_LIGNE", [this](Evt* e) { afficher_ligne(e); });
  addBranch("MODIFICATION", [this](Evt* e) { modification(e); });
  addBranch("CREATION", [this](Evt* e) { creation(e); });
  addBranch("DEBUT_VISUALISATION", [this](Evt* e) { debut_visualisation(e); });
  addBranch("DEBUT_MODIFICATION", [this](Evt* e) { debut_modification(e); });
  addBranch("DEBUT_CREATION", [this](Evt* e) { debut_creation(e); });
  addBranch("AVANT_SUPPRESSION", [this](Evt* e) { avant_suppression(e); });
  addBranch("DEBUT_LIGNE", [this](Evt* e) { debut_ligne(e); });
  addBranch("DEBUT_FICHE_VIDE", [this](Evt* e) { debut_fiche_vide(e); });
  addBranch("VALIDATION", [this](Evt* e) { validation(e); });
  addBranch("FIN_MODIFICATION", [this](Evt* e) { fin_modification(e); });
  addBranch("FIN_CREATION", [this](Evt* e) { fin_creation(e); });
  addBranch("APRES_SUPPRESSION", [this](Evt* e) { apres_suppression(e); });
  addBranch("DIALOGUE", [this](Evt* e) { dialogue(e); });
  addBranch("P1", [this](Evt* e) { p1(e); });
  addBranch("P2", [this](Evt* e) { p1(e); });
  addBranch("P3", [this](Evt* e) { p1(e); });
  addBranch("P1_ENTREE", [this](Evt* e) { p1_entree(e); });
  addBranch("P2_ENTREE", [this](Evt* e) { p1_entree(e); });
  addBranch("P3_ENTREE", [this](Evt* e) { p1_entree(e); });
  addBranch("CACHER_FONCTIONS", [this](Evt* e) { cacher_fonctions(e); });
  addBranch("INTERDIRE_FONCTIONS", [this](Evt* e) { interdire_fonctions(e); });
  addBranch("LST_C1", [this](Evt* e) { lst_c1(e); });
  addBranch("LST_C1_CHOISIR", [this](Evt* e) { lst_c1_choisir(e); });
  addBranch("PIECE_SAISIR", [this](Evt* e) { piece_saisir(e); });
  addBranch("PIECE_CHOISIR", [this](Evt* e) { piece_choisir(e); });
  addBranch("PIECE_CONTROLER", [this](Evt* e) { piece_controler(e); });
  addBranch("PIECE_CALCULER", [this](Evt* e) { piece_calculer(e); });
  addBranch("AFEFFO_SAISIR", [this](Evt* e) { afeffo_saisir(e); });
  addBranch("AFEFFO_CHOISIR", [this](Evt* e) { afeffo_choisir(e); });
  addBranch("AFEFFO_CONTROLER", [this](Evt* e) { afeffo_controler(e); });
  addBranch("AFEFFO_CALCULER", [this](Evt* e) { afeffo_calculer(e); });
  addBranch("CONSULTER_PIECE", [this](Evt* e) { consulter_piece(e); });
  addBranch("AFEFFO_CONSULTER", [this](Evt* e) { afeffo_consulter(e); });
  addBranch("PIECE_CONSULTER", [this](Evt* e) { piece_consulter(e); });
  addBranch("VALIDER_PIECE", [this](Evt* e) { valider_piece(e); });
  addBranch("TRANSFORMER_BR", [this](Evt* e) { transformer_br(e); });
  addBranch("TRANSFORMER_FACTURE", [this](Evt* e) { transformer_facture(e); });
  addBranch("TRANSFORMER(3,4)", [this](Evt* e) { transformer__3__4(e); });
  addBranch("AJOUTER_PIECE", [this](Evt* e) { ajouter_piece(e); });
  addBranch("SOLDER_RAL", [this](Evt* e) { solder_ral(e); });
  addBranch("SOLDER_RAF", [this](Evt* e) { solder_raf(e); });
  addBranch("POINTER_TEMPS", [this](Evt* e) { pointer_temps(e); });
  addBranch("SAUVEGARDE", [this](Evt* e) { sauvegarde(e); });
  addBranch("AVANT_SORTIE", [this](Evt* e) { avant_sortie(e); });
  addBranch("CALCUL_TOTAUX", [this](Evt* e) { calcul_totaux(e); });
  addBranch("B_VALID_DOC", [this](Evt* e) { b_valid_doc(e); });
  addBranch("VALID_DOC", [this](Evt* e) { valid_doc(e); });
  addBranch("B_ABAND_DOC", [this](Evt* e) { b_aband_doc(e); });
  addBranch("CTRL_DEBUT_MODIF", [this](Evt* e) { ctrl_debut_modif_doc(e); });
}

// ---- Helpers ----

int QUARVOGestion::executer(const std::string& label) {
  EvtParamVal none;
  appelerProcedure("", "", "", label, &none, 0);
  return erreurMethode();
}

Valeur QUARVOGestion::lu(const std::string& record, const std::string& column) {
  Table t(this, "VOVOVA", record, "LU");
  return t.valeur(column);
}

void QUARVOGestion::message(const std::string& number, std::vector<std::string> args) {
  frame::messageOk(*this, vChoix_, number, std::move(args));
}

bool QUARVOGestion::question(const std::string& number, std::vector<std::string> args) {
  return frame::messageOn(*this, vChoix_, number, std::move(args));
}

void QUARVOGestion::refuserSaisie(Evt* evt) {
  controler("LST_C1");
  rejeter(evt);
  erreurMethode(1, evt);
}

std::string QUARVOGestion::tableLignes() const {
  const std::string& c = vcompo_.text();
  if (c == "GAPECOM") return "GAPLCOM";
  if (c == "GAPEBL") return "GAPLBL";
  if (c == "GAPEFAC") return "GAPLFAC";
  return {};
}

void QUARVOGestion::activerOnglet(const std::string& tab) {
  ecran().selectionnerOnglet(tab);
  executer(tab + "_ENTREE");
}

bool QUARVOGestion::ligneAffichee(Table& lignes) {
  std::string c = lignes.valeur("COMPOSANT").toChaine();
  // A line being filled has no group yet: it belongs to the one shown.
  return c.empty() || c == vcompo_.text() ||
         (vcompo_.text() == "GAPEFAC" && c == "AFEFFO" && !liaisonGroupes());
}

void QUARVOGestion::remplirLigne(const std::string& composant, const std::string& record) {
  Table& l = ligne();
  std::string piece = lu(record, "NUMERO_DOC").toChaine();
  l.ecrire("COMPOSANT", Valeur::chaine(composant));
  l.ecrire("COMPOSANT_IDENT", lu(record, "IDENT"));
  l.ecrire("PIECE", Valeur::chaine(piece));
  l.ecrire("DATE_PIECE", lu(record, composant == "AFEFFO" ? "DATE_PIECE" : "DATE_CREATION"));
  l.ecrire("QTE", vqte_.value());
  l.ecrire("HT", vht_.value());
  l.ecrire("QTT", vqtt_.value());
  l.ecrire("DATE_MAJ", lu(record, "DATE_MAJ"));
  l.ecrire("HEURE_MAJ", lu(record, "HEURE_MAJ"));
  // The keys at once: the same piece typed twice before a save is found by them.
  l.ecrire("CLE_COMPO", Valeur::chaine(frame::cleCompo(pident2_.text(), composant, piece)));
  l.ecrire("CLE_COMPO2",
           Valeur::chaine(frame::cleCompo2(composant, lu(record, "IDENT").toChaine())));
}

void QUARVOGestion::viderLigne() {
  Table& l = ligne();
  for (const char* c : {"COMPOSANT", "COMPOSANT_IDENT", "PIECE", "DATE_PIECE", "DATE_MAJ",
                        "HEURE_MAJ", "CLE_COMPO", "CLE_COMPO2"}) {
    l.ecrire(c, Valeur::chaine(""));
  }
  for (const char* c : {"QTE", "QTT"}) l.ecrire(c, Valeur::dbl(0));
  l.ecrire("HT", Valeur::monnaie(Monnaie()));
}

double QUARVOGestion::quantiteLibre() {
  // What the budget line budgets, less what the other lines of the same group hold: not the
  // line being entered itself, which is what is being computed.
  double libre = vQbud_.dbl();
  std::string courant =
      ligne().courantId() != 0 && mode() != 'C' ? colonne("IDENT").toChaine() : std::string();
  memoire_.effacerCriteres();
  memoire_.ouvrir();
  while (memoire_.lire(1) == 0) {
    if (memoire_.valeur("AFLBUD_IDENT").toChaine() != pident2_.text()) continue;
    if (memoire_.valeur("COMPOSANT").toChaine() != vcompo_.text()) continue;
    if (!courant.empty() && memoire_.valeur("IDENT").toChaine() == courant) continue;
    libre -= toDouble(memoire_.valeur("QTE"));
  }
  return std::max(libre, 0.0);
}

// ---- Opening ----

void QUARVOGestion::debut_tri(Evt* evt) {
  auto refuser = [this](const std::string& number, std::vector<std::string> args) {
    message(number, std::move(args));
    sortir();
  };
  if (appeler(*this, "AFSOCI", "LECTURE_CODE", {val("SOCIETE")}) != 0) {
    return refuser("14", {});
  }
  vLiaisonG_.assign(lu("I_AFSOCI", "LIAISON_G"));
  vOption8_.assign(lu("I_AFSOCI", "OPTION8"));
  vLibPiece_.set("Pièce");
  vLibPiece1_.set("Devis :");
  vLibPiece2_.set("Commande :");
  vCritereAchat_.set("0");
  if (appeler(*this, "AFPARA", "LECTURE_CODE", {val("MACHAT")}) == 0 &&
      lu("I_AFPARA", "PARAM3").toChaine() != "0" && !lu("I_AFPARA", "PARAM3").toChaine().empty()) {
    vCritereAchat_.assign(lu("I_AFPARA", "PARAM1"));
  }
  std::string mois = lu("I_AFSOCI", "MOIS_ANNEE").toChaine();
  vmo_.set(mois.size() >= 2 ? mois.substr(0, 2) : "");
  van_.set(mois.size() >= 6 ? mois.substr(2, 4) : "");
  vanmo_.set(van_.text() + vmo_.text());
  auto debutMois = Date::parse("01/" + vmo_.text() + "/" + van_.text());
  vdebmo_.set(debutMois ? *debutMois : Date());
  vfinmo_.set(debutMois ? debutMois->lastOfMonth() : Date());
  appeler(*this, "AFSOCI", "CONTROLER_DATE", {ref(vfinmo_), ref(n_), ref(m_)});

  // The budget, its project, the line and its service; the line must be one of the budget's.
  if (appeler(*this, "AFEBUD", "LECTURE", {pident1_.value()}) != 0) {
    return refuser("16", {pident1_.text()});
  }
  vBudgetPiece_.assign(lu("I_AFEBUD", "PIECE"));
  vCodeEtat_.assign(lu("I_AFEBUD", "CODE_ETAT"));
  Monnaie revise = toMonnaie(lu("I_AFEBUD", "VBUD_REV"));
  vafebudHt_.set(revise != Monnaie() ? revise : toMonnaie(lu("I_AFEBUD", "VBUD_INI")));
  if (std::string etat = libelleEtat(vCodeEtat_.text()); !etat.empty()) vetat_.set(etat);
  vAffaIdent_.assign(lu("I_AFEBUD", "AFAFFA_IDENT"));
  if (appeler(*this, "AFAFFA", "LECTURE", {vAffaIdent_.value()}) == 0) {
    vAffaCode_.assign(lu("I_AFAFFA", "CODE"));
  }
  if (appeler(*this, "AFLBUD", "LECTURE", {pident2_.value()}) != 0 ||
      lu("I_AFLBUD", "NUMERO").toChaine().rfind(pident1_.text() + "|", 0) != 0) {
    return refuser("17", {pident2_.text(), pident1_.text()});
  }
  vLigneNumero_.assign(lu("I_AFLBUD", "NUMERO"));
  vLigneDesig_.assign(lu("I_AFLBUD", "DESIG"));
  vQbud_.assign(lu("I_AFLBUD", "QBUD"));
  vPresIdent_.assign(lu("I_AFLBUD", "AFPRES_IDENT"));
  if (appeler(*this, "AFPRES", "LECTURE", {vPresIdent_.value()}) == 0) {
    vNature_.assign(lu("I_AFPRES", "NATURE"));
  }
  if (vBudgetPiece_.text() != "MANUEL") {
    std::string origine = lu("I_AFEBUD", "ORIGINE").toChaine();
    if (origine == "GCPEDEV") vLibPiece_.assign(vLibPiece1_.value());
    if (origine == "GCPECOM") vLibPiece_.assign(vLibPiece2_.value());
  }

  origine_.effacerCriteres();
  origine_.ajouterCritere("AFLBUD_IDENT", '=', pident2_.value());
  vtableVide_.set(int64_t{origine_.lire(3) == 0 ? 0 : 1});
  for (const char* composant : {"AFEFFO", "GAPEFAC", "GAPEBL", "GAPECOM"}) {
    origine_.effacerCriteres();
    origine_.ajouterCritere("AFLBUD_IDENT", '=', pident2_.value());
    origine_.ajouterCritere("COMPOSANT", '=', Valeur::chaine(composant));
    if (origine_.lire(3) == 0) vcompo_.set(composant);
  }
  erreurMethode(0, evt);
}

void QUARVOGestion::debut(Evt*) {
  executer("CACHER_FONCTIONS");
  if (liaisonGroupes()) {
    const std::string& c = vcompo_.text();
    // An empty document of a company that links orders starts on the orders.
    if (c == "GAPECOM" || c.empty()) activerOnglet("P1");
    if (c == "GAPEBL") activerOnglet("P2");
    if (c == "GAPEFAC") activerOnglet("P3");
  } else {
    activerOnglet("P3");
  }
  executer("CALCUL_TOTAUX");
  vdialogue_.set(int64_t{1});
}

void QUARVOGestion::selection(Evt*) {
  executer("AFFICHER_LIGNE");
}

void QUARVOGestion::lst_liste_vide(Evt*) {
  interdire("POINTER_TEMPS");
}

void QUARVOGestion::p1(Evt* evt) {
  if (mode() == 'M' || mode() == 'C') refuserSaisie(evt);
}

void QUARVOGestion::p1_entree(Evt*) {
  std::string tab = ecran().onglet();
  std::string voulu = tab == "P1"   ? "GAPECOM"
                      : tab == "P2" ? "GAPEBL"
                                    : (liaisonGroupes() ? "GAPEFAC" : "AFEFFO");
  if (vcompo_.text() != voulu) {
    vcompo_.set(voulu);
    rafraichir();
    executer("CALCUL_TOTAUX");
  }
  executer("INTERDIRE_FONCTIONS");
  executer("CACHER_FONCTIONS");
}

void QUARVOGestion::cacher_fonctions(Evt*) {
  const std::string& c = vcompo_.text();
  auto montrer = [this](const char* control, bool shown) {
    shown ? rendreVisible(control) : cacher(control);
  };
  montrer("TRANSFORMER_BR", c == "GAPECOM");
  montrer("TRANSFORMER_FACTURE", c == "GAPECOM" || c == "GAPEBL");
  montrer("SOLDER_RAL", c == "GAPECOM");
  montrer("SOLDER_RAF", c == "GAPEBL");
  if (!liaisonGroupes()) {
    cacher("P1");
    cacher("P2");
  }
}

void QUARVOGestion::interdire_fonctions(Evt*) {
  bool saisie = mode() != 'V';
  for (const char* b : {"B_VALID_DOC", "B_ABAND_DOC"}) saisie ? autoriser(b) : interdire(b);
  saisie ? interdire("LST_C1_CHOISIR") : autoriser("LST_C1_CHOISIR");
  bool aUnePiece = ligne().courantId() != 0 || mode() == 'C';
  std::string composant = aUnePiece ? colonne("COMPOSANT").toChaine() : "";
  bool piece =
      aUnePiece && !colonne("COMPOSANT_IDENT").toChaine().empty() && composant == vcompo_.text();
  if (!piece) {
    for (const char* f : kFonctionsPiece) interdire(f);
  } else {
    autoriser("CONSULTER_PIECE");
    if (vcompo_.text() != "AFEFFO" && !vcompo_.text().empty()) {
      appeler(*this, vcompo_.text(), "LECTURE", {colonne("COMPOSANT_IDENT")});
      std::string record = "I_" + vcompo_.text();
      if (toEntier(lu(record, "VALIDEE")) == 0 && mode() != 'C') {
        autoriser("VALIDER_PIECE");
        for (const char* f : kTransformations) interdire(f);
      } else {
        interdire("VALIDER_PIECE");
        bool reste = toDouble(lu(record, "QTNT")) != 0 && mode() != 'C';
        for (const char* f : kTransformations) reste ? autoriser(f) : interdire(f);
      }
    }
  }
  autoriser("MODIFICATION");
  autoriser("SUPPR");
  if (!piece) {
    interdire("MODIFICATION");
    interdire("SUPPR");
  }
  // A line's piece is not changed in place: the line is deleted and the piece typed again.
  if (aUnePiece && !colonne("PIECE").toChaine().empty()) interdire("MODIFICATION");
}

void QUARVOGestion::afficher_ligne(Evt*) {
  vetatPiece_.set("");
  vorigine_.set("");
  if (vcompo_.text().empty() || ligne().courantId() == 0) return;
  std::string ident = colonne("COMPOSANT_IDENT").toChaine();
  if (ident.empty()) return;
  std::string composant = colonne("COMPOSANT").toChaine();
  if (composant == "AFEFFO") {
    if (appeler(*this, "AFEFFO", "LECTURE", {val(ident)}) == 0) {
      appeler(*this, "AFFOUR", "LECTURE", {lu("I_AFEFFO", "AFFOUR_IDENT")});
    }
    return;
  }
  if (appeler(*this, composant, "LECTURE", {val(ident)}) != 0) return;
  std::string record = "I_" + composant;
  appeler(*this, "AFFOUR", "LECTURE", {lu(record, "GCPFOUR_IDENT")});
  vorigine_.assign(lu(record, "ORIGINE"));
  std::string icone = "ETAT1.PNG";
  if (toEntier(lu(record, "VALIDEE")) == 1) {
    icone = "ETAT2.PNG";
    double qtnt = toDouble(lu(record, "QTNT"));
    if (qtnt != toDouble(lu(record, "QTT"))) icone = "ETAT4.PNG";
    if (qtnt == 0) icone = "ETAT3.PNG";
  }
  vetatPiece_.set(icone);
}

void QUARVOGestion::calcul_totaux(Evt*) {
  Monnaie commandes, receptions, factures;
  memoire_.effacerCriteres();
  memoire_.ouvrir();
  while (memoire_.lire(1) == 0) {
    if (memoire_.valeur("AFLBUD_IDENT").toChaine() != pident2_.text()) continue;
    std::string c = memoire_.valeur("COMPOSANT").toChaine();
    Monnaie ht = toMonnaie(memoire_.valeur("HT"));
    if (c == "GAPECOM") commandes += ht;
    if (c == "GAPEBL") receptions += ht;
    if (c == "GAPEFAC" || c == "AFEFFO") factures += ht;
  }
  vtotGapecom_.set(commandes);
  vtotGapebl_.set(receptions);
  vtotGapefac_.set(factures);
}

// ---- Line events ----

void QUARVOGestion::modification(Evt* evt) {
  if (colonne("COMPOSANT").toChaine() != vcompo_.text()) refuserSaisie(evt);
}

void QUARVOGestion::avant_suppression(Evt* evt) {
  if (colonne("COMPOSANT").toChaine() != vcompo_.text()) refuserSaisie(evt);
}

void QUARVOGestion::creation(Evt*) {
  if (vtableVide_.entier() == 1) {
    // A document that opens without lines opens to be looked at, not with a line to fill.
    vtableVide_.set(int64_t{0});
    executer("VISUALISATION");
  }
}

void QUARVOGestion::debut_visualisation(Evt*) {
  executer("INTERDIRE_FONCTIONS");
  interdire("POINTER_TEMPS");
  std::string c = ligne().courantId() != 0 ? colonne("COMPOSANT").toChaine() : "";
  if (vNature_.text() == "P" && (c == "GAPEFAC" || c == "AFEFFO")) autoriser("POINTER_TEMPS");
}

void QUARVOGestion::debut_modification(Evt*) {
  executer("INTERDIRE_FONCTIONS");
  interdire("POINTER_TEMPS");
}

void QUARVOGestion::debut_creation(Evt*) {
  Table& l = ligne();
  l.ecrire("AFEBUD_IDENT", pident1_.value());
  l.ecrire("AFAFFA_IDENT", vAffaIdent_.value());
  l.ecrire("AFAFFA_CODE", vAffaCode_.value());
  l.ecrire("AFLBUD_IDENT", pident2_.value());
  executer("INTERDIRE_FONCTIONS");
  interdire("POINTER_TEMPS");
}

void QUARVOGestion::debut_ligne(Evt* evt) {
  executer("INTERDIRE_FONCTIONS");
  executer("CACHER_FONCTIONS");
  if (mode() == 'V') executer("DEBUT_VISUALISATION");
  controler("LST_C1");
  rejeter(evt);
}

void QUARVOGestion::debut_fiche_vide(Evt*) {
  executer("INTERDIRE_FONCTIONS");
  executer("CACHER_FONCTIONS");
  interdire("POINTER_TEMPS");
}

void QUARVOGestion::validation(Evt* evt) {
  bool achat = vcompo_.text() != "AFEFFO";
  if (achat && colonne("PIECE").toChaine().empty()) {
    BoiteDialogue("Attention", "La saisie d'un no de pièce est obligatoire !", 0, {"$1~OK"});
    refuserSaisie(evt);
    return;
  }
  if (colonne("IDENT").toChaine().empty()) {
    Field ident("IDENT_LIEN", "", "", 4, Kind::Chaine, Valeur::chaine(""), this);
    if (!frame::numeroter(*this, "VOVOVA", "QUARVO", ident)) {
      refuserSaisie(evt);
      return;
    }
    ligne().ecrire("IDENT", ident.value());
  }
  vchoixPiece_.set("N");
}

void QUARVOGestion::fin_modification(Evt*) {
  executer("CALCUL_TOTAUX");
  executer("INTERDIRE_FONCTIONS");
}

void QUARVOGestion::fin_creation(Evt*) {
  executer("CALCUL_TOTAUX");
  executer("INTERDIRE_FONCTIONS");
}

void QUARVOGestion::apres_suppression(Evt*) {
  // The time pointing of the row goes with it at the save: abandoning keeps it.
  supprimees_.push_back(identSupprime());
  executer("CALCUL_TOTAUX");
  executer("INTERDIRE_FONCTIONS");
}

void QUARVOGestion::dialogue(Evt* evt) {
  Field type("TYPE", "", "", 4, Kind::Chaine, Valeur::chaine(""), this);
  Field reponse("REPONSE", "", "", 4, Kind::Entier, Valeur::entier(0), this);
  lierParametres(evt, {{&type, 0}, {&reponse, 1}});
  if (vdialogue_.entier() == 0) {
    vdialogue_.set(int64_t{1});
    reponse.set(int64_t{1});
    return;
  }
  if (type.text() == "TABLE_VIDE_ET_CREATION" || type.text() == "AB_CREAT") {
    reponse.set(int64_t{1});
  } else if (type.text() == "VOULEZ_VOUS_SAUVER") {
    vdialogue_.set(int64_t{0});
  }
}

// ---- Entering a piece ----

void QUARVOGestion::lst_c1(Evt* evt) {
  if (!colonne("PIECE").toChaine().empty() && vchoixPiece_.text() == "N") {
    appelerProcedure("", "", "", vcompo_.text() == "AFEFFO" ? "AFEFFO_SAISIR" : "PIECE_SAISIR", evt,
                     0);
  }
}

void QUARVOGestion::lst_c1_choisir(Evt*) {
  vchoixPiece_.set("O");
  // The chosen piece goes on the line being entered, or on a new one.
  if (!enSaisie() && !creerLigne()) {
    vchoixPiece_.set("N");
    return;
  }
  executer("CTRL_DEBUT_MODIF");
  executer(vcompo_.text() == "AFEFFO" ? "AFEFFO_CHOISIR" : "PIECE_CHOISIR");
  executer("AFFICHER_LIGNE");
  executer("INTERDIRE_FONCTIONS");
  rafraichir();
}

void QUARVOGestion::piece_saisir(Evt* evt) {
  const std::string& composant = vcompo_.text();
  if (appeler(*this, composant, "LECTURE_NUMERO_DOC", {colonne("PIECE")}) != 0) {
    message("87");
    refuserSaisie(evt);
    return;
  }
  if (executer("PIECE_CONTROLER") != 0) return refuserSaisie(evt);
  EvtParamRef calcul{ref(vqte_), ref(vht_), ref(vqtt_)};
  appelerProcedure("", "", "", "PIECE_CALCULER", &calcul, 0);
  if (erreurMethode() != 0) return refuserSaisie(evt);
  remplirLigne(composant, "I_" + composant);
  executer("AFFICHER_LIGNE");
  executer("INTERDIRE_FONCTIONS");
  erreurMethode(0, evt);
}

void QUARVOGestion::piece_choisir(Evt*) {
  const std::string& composant = vcompo_.text();
  Field vident("VIDENT", "", "", 4, Kind::Chaine, colonne("COMPOSANT_IDENT"), this);
  appeler(*this, composant, "AFFECTE_PARAMETRES", {val(""), vAffaCode_.value()});
  bool ok = appeler(*this, composant, "CHOISIR", {ref(vident)}) == 0 && !vident.text().empty() &&
            appeler(*this, composant, "LECTURE", {vident.value()}) == 0;
  if (ok) {
    // The piece's number goes on the line first: the checks look for it.
    ligne().ecrire("PIECE", lu("I_" + composant, "NUMERO_DOC"));
    ok = executer("PIECE_CONTROLER") == 0;
  }
  if (ok) {
    EvtParamRef calcul{ref(vqte_), ref(vht_), ref(vqtt_)};
    appelerProcedure("", "", "", "PIECE_CALCULER", &calcul, 0);
    ok = erreurMethode() == 0;
  }
  if (ok) {
    remplirLigne(composant, "I_" + composant);
  } else {
    viderLigne();
  }
}

void QUARVOGestion::piece_controler(Evt* evt) {
  std::string record = "I_" + vcompo_.text();
  if (vOption8_.text() != "O" && toEntier(lu(record, "VALIDEE")) != 1) {
    message("684");
    erreurMethode(1, evt);
    return;
  }
  if (apresLeMois(toDate(lu(record, "DATE_CREATION")), evt)) return;
  verreur_.set(int64_t{0});
  appeler(*this, "QUARVO", "ANALYSER",
          {vcompo_.value(), lu(record, "IDENT"), val("0"), val(""), ref(verreur_)});
  if (verreur_.entier() != 0) {
    erreurMethode(1, evt);
    return;
  }
  if (dejaSurLaLigne(vcompo_.text(), evt)) return;
  erreurMethode(0, evt);
}

void QUARVOGestion::piece_calculer(Evt* evt) {
  Field qte("VQTE", "", "", 4, Kind::Double, Valeur::dbl(0), this);
  Field ht("VHT", "", "", 4, Kind::Monnaie, Valeur::monnaie(Monnaie()), this);
  Field qtt("VQTT", "", "", 4, Kind::Double, Valeur::dbl(0), this);
  lierParametres(evt, {{&qte, 1}, {&ht, 1}, {&qtt, 1}});
  vaflbudQte_.set(quantiteLibre());
  const std::string& composant = vcompo_.text();
  std::string record = "I_" + composant;
  std::string lignes = tableLignes();
  std::string pieceIdent = lu(record, "IDENT").toChaine();
  auto colonneEntete = [this, &record](const std::string& c) { return lu(record, c); };
  frame::EnteteAchat entete = frame::enteteAchat(composant, colonneEntete);
  std::string secanEntete = lu(record, "SECAN_CODE").toChaine();
  double vq = 0;
  double vt = 0;
  Monnaie montant;
  bool compte = false;
  appeler(*this, lignes, "POSDEBUT", {val(pieceIdent)});
  while (appeler(*this, lignes, "LECTURE_SUIVANT") == 0) {
    std::string ligneRecord = "I_" + lignes;
    appeler(*this, "GCPARTIC", "LECTURE", {lu(ligneRecord, "GCPARTIC_IDENT")});
    vPrestationIdent_.set("");
    appeler(*this, "AFPARA", "REGROUPEMENT_ACHAT",
            {vCritereAchat_.value(), lu("I_GCPARTIC", "IDENT"), lu("I_GCPARTIC", "GCPCRIT1_IDENT"),
             lu("I_GCPARTIC", "GCPCRIT2_IDENT"), lu("I_GCPARTIC", "GCPCRIT3_IDENT"),
             ref(vPrestationIdent_)});
    if (vPrestationIdent_.text() != vPresIdent_.text()) continue;
    std::string secan =
        secanEntete.empty() ? lu(ligneRecord, "SECAN_CODE").toChaine() : secanEntete;
    if (secan != vAffaCode_.text()) continue;
    compte = true;
    auto colonneLigne = [this, &ligneRecord](const std::string& c) { return lu(ligneRecord, c); };
    frame::ApportLigne apport = frame::apportLigne(entete, frame::ligneAchat(colonneLigne));
    vq += apport.qte;
    vt += apport.qtt;
    montant += apport.ht;
  }
  if (!compte) {
    message("90");
    erreurMethode(1, evt);
    return;
  }
  if (vctrlCode_.text() != "PIECE_CONSULTER") {
    // What links of the same piece to other lines of the same service hold is not counted
    // twice; this very line's saved links are the document's own, held in its memory table.
    liens_.effacerCriteres();
    liens_.ajouterCritere("CLE_COMPO2", '=',
                          Valeur::chaine(frame::cleCompo2(composant, pieceIdent)));
    liens_.ouvrir();
    while (liens_.lire(1) == 0) {
      std::string autre = liens_.valeur("AFLBUD_IDENT").toChaine();
      if (autre == pident2_.text()) continue;
      if (aflbud_.chercher(3, "IDENT", '=', Valeur::chaine(autre)) != 0) continue;
      if (aflbud_.valeur("AFPRES_IDENT").toChaine() != vPresIdent_.text()) continue;
      if (liens_.valeur("AFAFFA_CODE").toChaine() != vAffaCode_.text()) continue;
      vq -= toDouble(liens_.valeur("QTE"));
      montant -= toMonnaie(liens_.valeur("HT"));
      vt -= toDouble(liens_.valeur("QTT"));
    }
  }
  vctrlCode_.set("");
  double libre = vaflbudQte_.dbl();
  if (vq > 0 && vq > libre && vQbud_.dbl() > 0) {
    // 1 links what is free, 2 links all, 3 (or no answer) goes back: each button says so.
    EvtParamRef choix{val("97"), ref(vChoix_), val("POINTAGE_PARTIEL"), val("POINTAGE_TOTAL"),
                      val("RETOUR")};
    appelerProcedure("*", "COMMUN", "INTERFACE", "MESS_CHOIX", &choix, -1);
    std::string reponse = vChoix_.text();
    if (reponse == "1") {
      if (libre <= 0) {
        message("18");
        erreurMethode(1, evt);
        return;
      }
      montant =
          valeurArrondie(montant * Monnaie::fromDouble(libre) / Monnaie::fromDouble(vq), 2, '=');
      vt = vt * libre / vq;
      vq = libre;
    } else if (reponse != "2") {
      erreurMethode(1, evt);
      return;
    }
  }
  qte.set(vq);
  ht.set(montant);
  qtt.set(vt);
  erreurMethode(0, evt);
}

// ---- Time entries ----

void QUARVOGestion::afeffo_saisir(Evt* evt) {
  if (appeler(*this, "AFEFFO", "LECTURE_NUMERO_DOC", {colonne("PIECE")}) != 0) {
    message("91");
    refuserSaisie(evt);
    return;
  }
  if (executer("AFEFFO_CONTROLER") != 0) return refuserSaisie(evt);
  EvtParamRef calcul{ref(vqte_), ref(vht_)};
  appelerProcedure("", "", "", "AFEFFO_CALCULER", &calcul, 0);
  if (erreurMethode() != 0) return refuserSaisie(evt);
  vqtt_.set(0.0);
  remplirLigne("AFEFFO", "I_AFEFFO");
  executer("AFFICHER_LIGNE");
  executer("INTERDIRE_FONCTIONS");
  erreurMethode(0, evt);
}

void QUARVOGestion::afeffo_choisir(Evt*) {
  Field vident("VIDENT", "", "", 4, Kind::Chaine, colonne("COMPOSANT_IDENT"), this);
  appeler(*this, "AFEFFO", "AFFECTE_PARAMETRES", {val(""), vAffaCode_.value()});
  bool ok = appeler(*this, "AFEFFO", "CHOIX", {ref(vident)}) == 0 && !vident.text().empty() &&
            appeler(*this, "AFEFFO", "LECTURE", {vident.value()}) == 0;
  if (ok) {
    ligne().ecrire("PIECE", lu("I_AFEFFO", "NUMERO_DOC"));
    ok = executer("AFEFFO_CONTROLER") == 0;
  }
  if (ok) {
    EvtParamRef calcul{ref(vqte_), ref(vht_)};
    appelerProcedure("", "", "", "AFEFFO_CALCULER", &calcul, 0);
    ok = erreurMethode() == 0;
  }
  if (ok) {
    vqtt_.set(0.0);
    remplirLigne("AFEFFO", "I_AFEFFO");
  } else {
    viderLigne();
  }
}

void QUARVOGestion::afeffo_controler(Evt* evt) {
  if (dejaSurLaLigne("AFEFFO", evt)) return;
  if (apresLeMois(toDate(lu("I_AFEFFO", "DATE_PIECE")), evt)) return;
  erreurMethode(0, evt);
}

bool QUARVOGestion::dejaSurLaLigne(const std::string& composant, Evt* evt) {
  std::string cle = frame::cleCompo(pident2_.text(), composant, colonne("PIECE").toChaine());
  std::string courant =
      ligne().courantId() != 0 && mode() != 'C' ? colonne("IDENT").toChaine() : std::string();
  memoire_.effacerCriteres();
  memoire_.ajouterCritere("CLE_COMPO", '=', Valeur::chaine(cle));
  memoire_.ouvrir();
  while (memoire_.lire(1) == 0) {
    if (memoire_.valeur("IDENT").toChaine() == courant) continue;  // the line itself
    message("88");
    erreurMethode(1, evt);
    return true;
  }
  return false;
}

bool QUARVOGestion::apresLeMois(const Date& date, Evt* evt) {
  if (vfinmo_.date().empty() || date.empty() || !(date > vfinmo_.date())) return false;
  message("89");
  erreurMethode(1, evt);
  return true;
}

void QUARVOGestion::afeffo_calculer(Evt* evt) {
  Field qte("VQTE", "", "", 4, Kind::Double, Valeur::dbl(0), this);
  Field ht("VHT", "", "", 4, Kind::Monnaie, Valeur::monnaie(Monnaie()), this);
  lierParametres(evt, {{&qte, 1}, {&ht, 1}});
  std::string entree = lu("I_AFEFFO", "IDENT").toChaine();
  double vq = 0;
  Monnaie montant;
  bool compte = false;
  aflffo_.effacerCriteres();
  aflffo_.ajouterCritere("NUMERO", '/', Valeur::chaine(entree + "|"));
  aflffo_.ouvrir();
  while (aflffo_.lire(1) == 0) {
    if (aflffo_.valeur("AFAFFA_IDENT").toChaine() != vAffaIdent_.text()) continue;
    if (aflffo_.valeur("AFPRES_IDENT").toChaine() != vPresIdent_.text()) continue;
    compte = true;
    vq += toDouble(aflffo_.valeur("QTE"));
    montant += toMonnaie(aflffo_.valeur("HT"));
  }
  if (!compte) {
    message("90");
    erreurMethode(1, evt);
    return;
  }
  qte.set(vq);
  ht.set(montant);
  erreurMethode(0, evt);
}

// ---- Functions on the piece of a line ----

void QUARVOGestion::consulter_piece(Evt*) {
  if (ligne().courantId() == 0 || colonne("COMPOSANT_IDENT").toChaine().empty()) return;
  executer(colonne("COMPOSANT").toChaine() == "AFEFFO" ? "AFEFFO_CONSULTER" : "PIECE_CONSULTER");
  executer("AFFICHER_LIGNE");
  executer("INTERDIRE_FONCTIONS");
  rafraichir();
}

void QUARVOGestion::piece_consulter(Evt*) {
  const std::string composant = colonne("COMPOSANT").toChaine();
  EvtParamVal ouvrir{colonne("COMPOSANT_IDENT"), pmode_.value()};
  appelerModule("", composant, composant + "-GESTION", &ouvrir);
  suivrePiece();
}

void QUARVOGestion::suivrePiece() {
  // The piece may have changed in its own document or been settled: the line follows it.
  const std::string composant = colonne("COMPOSANT").toChaine();
  if (appeler(*this, composant, "LECTURE", {colonne("COMPOSANT_IDENT")}) != 0) return;
  std::string record = "I_" + composant;
  // A piece whose stamp is the one the line took when it was linked has not changed: the line
  // stays as it is (a part linked stays that part, and nothing is asked).
  if (lu(record, "DATE_MAJ").toChaine() == colonne("DATE_MAJ").toChaine() &&
      lu(record, "HEURE_MAJ").toChaine() == colonne("HEURE_MAJ").toChaine()) {
    return;
  }
  vdate_.assign(lu(record, "DATE_CREATION"));
  vctrlCode_.set("PIECE_CONSULTER");
  EvtParamRef calcul{ref(vqte_), ref(vht_), ref(vqtt_)};
  appelerProcedure("", "", "", "PIECE_CALCULER", &calcul, 0);
  vctrlCode_.set("");
  if (erreurMethode() != 0) return;
  bool change = vdate_.text() != colonne("DATE_PIECE").toChaine() ||
                vqte_.dbl() != toDouble(colonne("QTE")) ||
                vht_.monnaie() != toMonnaie(colonne("HT")) ||
                vqtt_.dbl() != toDouble(colonne("QTT"));
  if (!change) return;
  executer("CTRL_DEBUT_MODIF");
  if (!enSaisie()) return;
  ligne().ecrire("DATE_PIECE", vdate_.value());
  ligne().ecrire("QTE", vqte_.value());
  ligne().ecrire("HT", vht_.value());
  ligne().ecrire("QTT", vqtt_.value());
  ligne().ecrire("DATE_MAJ", lu(record, "DATE_MAJ"));
  ligne().ecrire("HEURE_MAJ", lu(record, "HEURE_MAJ"));
  presserBouton("B_VALID_LIGNE");
}

void QUARVOGestion::afeffo_consulter(Evt*) {
  EvtParamVal ouvrir{colonne("COMPOSANT_IDENT"), pmode_.value()};
  appelerModule("", "AFEFFO", "AFEFFO-GESTION", &ouvrir);
  if (appeler(*this, "AFEFFO", "LECTURE", {colonne("COMPOSANT_IDENT")}) != 0) return;
  vdate_.assign(lu("I_AFEFFO", "DATE_PIECE"));
  EvtParamRef calcul{ref(vqte_), ref(vht_)};
  appelerProcedure("", "", "", "AFEFFO_CALCULER", &calcul, 0);
  if (erreurMethode() != 0) return;
  bool change = vdate_.text() != colonne("DATE_PIECE").toChaine() ||
                vqte_.dbl() != toDouble(colonne("QTE")) ||
                vht_.monnaie() != toMonnaie(colonne("HT"));
  if (!change) return;
  executer("CTRL_DEBUT_MODIF");
  if (!enSaisie()) return;
  ligne().ecrire("DATE_PIECE", vdate_.value());
  ligne().ecrire("QTE", vqte_.value());
  ligne().ecrire("HT", vht_.value());
  presserBouton("B_VALID_LIGNE");
}

void QUARVOGestion::valider_piece(Evt*) {
  if (!question("1")) return;
  if (appeler(*this, vcompo_.text(), "VALIDE_DOCUMENT", {colonne("COMPOSANT_IDENT")}) != 0) {
    message("92");
    return;
  }
  executer("INTERDIRE_FONCTIONS");
  rafraichir();
}

void QUARVOGestion::transformer_br(Evt*) {
  executer("TRANSFORMER3");
}

void QUARVOGestion::transformer_facture(Evt*) {
  executer("TRANSFORMER4");
}

void QUARVOGestion::transformer__3__4(Evt* evt) {
  int n = numeroBranche();
  erreurMethode(0, evt);
  const std::string composant = vcompo_.text();
  Field modes("V_MODE", "", "", 4, Kind::Chaine, Valeur::chaine("MC"), this);
  appeler(*this, composant, "LECTURE", {colonne("COMPOSANT_IDENT")});
  appeler(*this, composant, "DROIT_TRANSFORMATION_DOC", {colonne("COMPOSANT_IDENT"), ref(modes)});
  if (modes.text().find('C') == std::string::npos || modes.text().find('M') == std::string::npos) {
    message("93");
    return;
  }
  if (!question("98", {colonne("PIECE").toChaine()})) return;
  EvtParamVal trf{val(int64_t{-n}), colonne("COMPOSANT_IDENT")};
  lancerModule("", composant, composant + "-TRF", &trf);
  executer("INTERDIRE_FONCTIONS");
  vtransformer_.set("O");
}

void QUARVOGestion::debut_activation(Evt*) {
  if (vtransformer_.text() != "O") return;
  vtransformer_.set("N");
  if (ligne().courantId() == 0) return;
  int64_t type = typeDe(vcompo_.text());
  if (type != -2 && type != -3) return;
  vtypeCible_.set(int64_t{0});
  videntCible_.set("");
  EvtParamRef chainage{val(type), colonne("COMPOSANT_IDENT"), ref(vtypeCible_), ref(videntCible_)};
  appelerModule("", "QUARVO", "QUARVO-EXISTE_CHAINAGE_AVAL", &chainage);
  executer("AJOUTER_PIECE");
}

void QUARVOGestion::ajouter_piece(Evt* evt) {
  if (vtypeCible_.entier() == 0 || videntCible_.text().empty()) return;
  std::string composant = composantDuType(vtypeCible_.entier());
  // The group follows the new piece's kind, whichever tab was shown.
  if (vtypeCible_.entier() == -3) activerOnglet("P2");
  if (vtypeCible_.entier() == -4) activerOnglet("P3");
  vcompo_.set(composant);
  if (appeler(*this, composant, "LECTURE", {videntCible_.value()}) != 0) return;
  std::string record = "I_" + composant;
  ligne().preparer();
  ligne().ecrire("PIECE", lu(record, "NUMERO_DOC"));
  if (executer("PIECE_CONTROLER") != 0) return;
  EvtParamRef calcul{ref(vqte_), ref(vht_), ref(vqtt_)};
  appelerProcedure("", "", "", "PIECE_CALCULER", &calcul, 0);
  if (erreurMethode() != 0) return;
  Field ident("IDENT_LIEN", "", "", 4, Kind::Chaine, Valeur::chaine(""), this);
  if (!frame::numeroter(*this, "VOVOVA", "QUARVO", ident)) return;
  ligne().ecrire("IDENT", ident.value());
  ligne().ecrire("AFEBUD_IDENT", pident1_.value());
  ligne().ecrire("AFAFFA_IDENT", vAffaIdent_.value());
  ligne().ecrire("AFAFFA_CODE", vAffaCode_.value());
  ligne().ecrire("AFLBUD_IDENT", pident2_.value());
  remplirLigne(composant, record);
  executer("AJOUTER_LIGNE");
  executer("CALCUL_TOTAUX");
  executer("INTERDIRE_FONCTIONS");
  rafraichir();
  vtypeCible_.set(int64_t{0});
  videntCible_.set("");
  erreurMethode(0, evt);
}

void QUARVOGestion::solder_ral(Evt*) {
  if (!question("94", {colonne("PIECE").toChaine()})) return;
  const std::string composant = vcompo_.text();
  EvtParamVal solder{colonne("COMPOSANT_IDENT")};
  appelerModule("", composant, composant + "-SOLDER", &solder);
  // The settled piece is linked for what settling left, as after a consultation.
  suivrePiece();
  executer("INTERDIRE_FONCTIONS");
  rafraichir();
}

void QUARVOGestion::solder_raf(Evt* evt) {
  solder_ral(evt);
}

void QUARVOGestion::pointer_temps(Evt*) {
  if (ligne().courantId() == 0) return;
  if (mode() != 'V' || indicateur() == 0) {
    // The document is saved and left first; the pointing opens as it closes.
    vdialogue_.set(int64_t{0});
    vpointerTemps_.set(int64_t{1});
    vpointerIdent_.assign(colonne("IDENT"));
    executer(mode() == 'C' ? "VA_CREAT" : "VALID_DOC");
    fermer();
    return;
  }
  std::string modes = vCodeEtat_.text() == "C" ? "Vv" : "VMCAv";
  if (appeler(*this, "QUARVO", "LECTURE", {colonne("IDENT")}) == 0) {
    appeler(*this, "AFPFST", "GESTION", {colonne("IDENT"), val(modes)});
  }
}

// ---- Saving and leaving ----

void QUARVOGestion::sauvegarde(Evt* evt) {
  // One transaction, opened by the document's save: the line's figures withdrawn, the rows
  // written, the figures booked again. Nothing is left for leaving to book.
  vvalidDoc_.set("O");
  if (appeler(*this, "QUARVO", "SUPPRESSION_MAJ", {pident2_.value()}) != 0) {
    rejeter(evt);
    return;
  }
  Gestion_doc::sauvegarde(evt);
  for (const auto& ident : supprimees_) appeler(*this, "AFPFST", "PURGER_QUARVO", {val(ident)});
  supprimees_.clear();
  if (appeler(*this, "QUARVO", "VALIDATION_MAJ", {pident2_.value()}) != 0) {
    rejeter(evt);
    return;
  }
  vvalidDoc_.set("N");
}

void QUARVOGestion::avant_sortie(Evt* evt) {
  if (vpointerTemps_.entier() == 1) {
    vpointerTemps_.set(int64_t{0});
    appeler(*this, "AFPFST", "GESTION", {vpointerIdent_.value(), pmode_.value()});
    executer("REDEMARRE");
    return;
  }
  if (vvalidDoc_.text() == "O") {
    vvalidDoc_.set("N");
    appeler(*this, "QUARVO", "VALIDATION_MAJ", {pident2_.value()});
  }
  erreurMethode(0, evt);
  if (vNature_.text() != "P") return;
  origine_.effacerCriteres();
  origine_.ajouterCritere("AFLBUD_IDENT", '=', pident2_.value());
  origine_.ouvrir();
  while (origine_.lire(1) == 0) {
    std::string c = origine_.valeur("COMPOSANT").toChaine();
    if (c != "GAPEFAC" && c != "AFEFFO") continue;
    std::string ident = origine_.valeur("COMPOSANT_IDENT").toChaine();
    std::string ressource;
    if (appeler(*this, c, "LECTURE", {val(ident)}) != 0) continue;
    appeler(*this, "AFFOUR", "LECTURE",
            {lu("I_" + c, c == "AFEFFO" ? "AFFOUR_IDENT" : "GCPFOUR_IDENT")});
    ressource = lu("I_AFFOUR", "IDENT").toChaine();
    if (ressource.empty() || afpers_.chercher(3, "AFFOUR_IDENT", '=', Valeur::chaine(ressource))) {
      continue;
    }
    if (afpfst_.chercher(3, "QUARVO_IDENT", '=', origine_.valeur("IDENT")) == 0) continue;
    erreurMethode(1, evt);
    if (question("96", {origine_.valeur("PIECE").toChaine()})) {
      erreurMethode(0, evt);
      return;
    }
  }
}

void QUARVOGestion::b_valid_doc(Evt*) {
  executer("VALID_DOC");
}

void QUARVOGestion::b_aband_doc(Evt*) {
  executer("ABAND_DOC");
}

void QUARVOGestion::ctrl_debut_modif_doc(Evt* evt) {
  ctrl_debut_modif(evt);
  if (mode() != 'V') {
    for (const char* b : {"B_VALID_DOC", "B_ABAND_DOC", "POINTER_TEMPS"}) interdire(b);
  }
}

}  // namespace quarvo
