#include "quarvo/analysis/QUARVOAnnuler.h"

#include <filesystem>

#include "host/Execute.h"
#include "host/session/Session.h"
#include "host/ui/Ecran.h"
#include "quarvo/frame/Appels.h"
#include "quarvo/frame/PieceKinds.h"

namespace quarvo {

using namespace host;
using frame::appeler;

namespace {

const frame::SorteSelection& kCommandes = frame::kCommandesSelection;
const frame::SorteSelection& kReceptions = frame::kReceptionsSelection;
const frame::SorteSelection& kFactures = frame::kFacturesSelection;

const char* const kBornes[] = {"BORNE1", "BORNE2", "BORNE3", "BORNE4",
                               "BORNE5", "BORNE6", "BORNE7"};

}  // namespace

QUARVOAnnuler::QUARVOAnnuler(Evt* evt)
    : Seletat(evt),
      vTypePiece_(chaine("VTYPE_PIECE", "Pièces", "T")),
      vNumMin_(chaine("VNUMMIN", "Du numéro")),
      vNumMax_(chaine("VNUMMAX", "Au numéro")),
      vExplications_(chaine("VEXPLICATIONS", "Explications")),
      vPiece_(chaine("VPIECE", "Pièce")),
      mo_(chaine("MO")),
      an_(chaine("AN")),
      vAnMo_(chaine("V_ANMO")),
      vPointer_(chaine("V_POINTER")),
      vEComposant_(chaine("V_ECOMPOSANT")),
      vLComposant_(chaine("V_LCOMPOSANT")),
      vZumdev_(chaine("V_ZUMDEV")),
      vFlag_(entier("V_FLAG")),
      vJauge1_(dbl("V_JAUGE1")),
      vJauge2_(dbl("V_JAUGE2")),
      vChoix_(chaine("V_CHOIX")),
      quarvo2_(this, "VOVOVA", "QUARVO", "QUARVO2"),
      gapecom_(this, "GESCOM", "GAPECOM", "CTX_GAPECOM"),
      gapebl_(this, "GESCOM", "GAPEBL", "CTX_GAPEBL"),
      gapefac_(this, "GESCOM", "GAPEFAC", "CTX_GAPEFAC"),
      gaplcom_(this, "GESCOM", "GAPLCOM", "CTX_GAPLCOM"),
      gaplbl_(this, "GESCOM", "GAPLBL", "CTX_GAPLBL"),
      gaplfac_(this, "GESCOM", "GAPLFAC", "CTX_GAPLFAC"),
      iAfsoci_(this, "VOVOVA", "I_AFSOCI", ""),
      eappr_(this, "VOVOVA", "M_EAPPR", ""),
      iGapefac_(this, "VOVOVA", "I_GAPEFAC", ""),
      lienComposant_("COMPOSANT", quarvo2_),
      lienComposantIdent_("COMPOSANT_IDENT", quarvo2_),
      moisAnnee_("MOIS_ANNEE", iAfsoci_),
      eComposant_("COMPOSANT", eappr_),
      eComposantIdent_("COMPOSANT_IDENT", eappr_),
      ePiece_("PIECE", eappr_),
      eIdent_("IDENT", eappr_),
      eDatePiece_("DATE_PIECE", eappr_),
      eHt_("HT", eappr_),
      eImputation_("IMPUTATION", eappr_),
      factureType_("TYPE", iGapefac_) {
  nomBase("VOVOVA");
  nomEcran("ANNULER");
  nomTable("QUARVO");
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
  addBranch("LST_SELECTION", [this](Evt* e) { lst_selection(e); });
  addBranch("LST_C5", [this](Evt* e) { lst_c5(e); });
  addBranch("VALIDATION", [this](Evt* e) { validation(e); });
  addBranch("APRES_VALIDATION", [this](Evt* e) { apres_validation(e); });
  addBranch("ABAND", [this](Evt* e) { aband(e); });
  addBranch("SORTIE_ECRAN", [this](Evt* e) { sortie_ecran(e); });
  addBranch("TERMINE", [this](Evt* e) { termine(e); });
  addBranch("DEPOINTER_PIECES", [this](Evt* e) { depointer_pieces(e); });
  addBranch("POINTER_PIECES", [this](Evt* e) { pointer_pieces(e); });
  addBranch("POINTER_PIECES_CF", [this](Evt* e) { pointer_pieces_cf(e); });
  addBranch("POINTER_PIECES_BF", [this](Evt* e) { pointer_pieces_bf(e); });
  addBranch("POINTER_PIECES_FF", [this](Evt* e) { pointer_pieces_ff(e); });
  addBranch("CREER_EAPPR", [this](Evt* e) { creer_eappr(e); });
  addBranch("ANNULER_PIECES", [this](Evt* e) { annuler_pieces(e); });
}

Valeur QUARVOAnnuler::entete(const std::string& column) {
  auto v = Execute::execute(*this, "CTX_" + vEComposant_.text() + "." + column);
  return v ? *v : Valeur();
}

void QUARVOAnnuler::appelInterne(const std::string& label, Evt* evt) {
  appelerProcedure("", "", "", label, evt, 0);
}

void QUARVOAnnuler::autoriserSelection(bool oui) {
  for (const char* control : kBornes) oui ? autoriser(control) : interdire(control);
  for (const char* control : {"VDATEMIN", "VDATEMAX"})
    oui ? autoriser(control) : interdire(control);
}

// ---- Opening ----

void QUARVOAnnuler::init(Evt* evt) {
  Seletat::init(evt);
  listeSur("LST", eappr_);
}

void QUARVOAnnuler::avant_debut(Evt* evt) {
  Seletat::avant_debut(evt);
  interdire("RECULER");
  interdire("VALID");
  interdire("TERMINE");
  // The tabs move by "AVANCER" and "RECULER" only: the list is never shown without being
  // built from the selection of the first tab.
  interdire("ONGLET");
}

void QUARVOAnnuler::debut(Evt* evt) {
  Seletat::debut(evt);
  // "M_EAPPR" is the session's: the imputation selection and its piece detail keep their
  // proposal there, which building this list would wipe out.
  for (Automate* fenetre : session().fenetresModales()) {
    const std::string& nom = fenetre->nomAutomate();
    if (nom == "QUARVO-IMPUTER" || nom == "QUARVO-IMPUTER1") {
      frame::messageOk(*this, vChoix_, "19", {"d'imputation des pièces d'achat"});
      erreurMethode(1, evt);
      sortir();
      return;
    }
  }
  if (appeler(*this, "AFSOCI", "LECTURE_CODE", {val("SOCIETE")}) != 0) {
    frame::messageOk(*this, vChoix_, "14");
    erreurMethode(1, evt);
    sortir();
    return;
  }
  std::string periode = moisAnnee_.text();
  mo_.set(periode.substr(0, 2));
  an_.set(periode.size() > 2 ? periode.substr(2, 4) : std::string());
  vAnMo_.set(an_.text() + mo_.text());
  vdatemin_.set(Date());
  auto premier = Date::parse("01/" + mo_.text() + "/" + an_.text());
  vdatemax_.set(premier ? premier->lastOfMonth() : Date());
  appeler(*this, "SYSASCII", "CONVERSION_CHEMIN", {val("[zumdev]"), ref(vZumdev_)});
  vExplications_.set(
      (std::filesystem::path(vZumdev_.text()) / "DOVERUVA" / "FICSTAND" / "MEMO2.TXT").string());
  // The work table is read by key, as the imputation reads it.
  session().memoire("M_EAPPR").setKey({"IDENT"});
  erreurMethode(0, evt);
}

void QUARVOAnnuler::debut_activation(Evt*) {
  afficherListe("LST");
}

// ---- First tab ----

void QUARVOAnnuler::vdatemin(Evt* evt) {
  erreurMethode(0, evt);
}
void QUARVOAnnuler::vdatemax(Evt* evt) {
  erreurMethode(0, evt);
}
void QUARVOAnnuler::vnummin(Evt* evt) {
  erreurMethode(0, evt);
}
void QUARVOAnnuler::vnummax(Evt* evt) {
  erreurMethode(0, evt);
}

void QUARVOAnnuler::vaffa_toutes(Evt* evt) {
  Seletat::vaffa_toutes(evt);
  reafficher("VAFFA_CODE");
}

void QUARVOAnnuler::vaffa_code_choisir(Evt* evt) {
  Seletat::vaffa_code_choisir(evt);
  reafficher("VAFFA_TOUTES");
  reafficher("VAFFA_CODE");
}

// ---- Tab moves ----

void QUARVOAnnuler::avancer(Evt* evt) {
  if (ecran().onglet() != "P1") return;
  if (!demanderOnglet("P2")) rejeter(evt);
}

void QUARVOAnnuler::reculer(Evt* evt) {
  if (ecran().onglet() != "P2") return;
  if (!demanderOnglet("P1")) rejeter(evt);
}

void QUARVOAnnuler::p1(Evt*) {
  autoriserSelection(true);
  autoriser("AVANCER");
  interdire("RECULER");
  interdire("VALID");
  interdire("TERMINE");
}

void QUARVOAnnuler::p2(Evt* evt) {
  if (vaffaToutes_.text() == "U" && vaffaCode_.text().empty()) {
    frame::messageOk(*this, vChoix_, "438");
    controler("VAFFA_TOUTES");
    rejeter(evt);
    return;
  }
  if (!frame::messageOn(*this, vChoix_, "432")) {
    rejeter(evt);
    return;
  }
  autoriserSelection(false);
  appelInterne("DEPOINTER_PIECES", evt);
  appelInterne("POINTER_PIECES", evt);
  afficherListe("LST");
  autoriser("RECULER");
  autoriser("VALID");
  interdire("AVANCER");
  interdire("TERMINE");
  erreurMethode(0, evt);
}

// ---- The list ----

void QUARVOAnnuler::depointer_pieces(Evt*) {
  if (vPointer_.text() == "N") return;
  eappr_.effacerCriteres();
  eappr_.supprimerTout();
  vPointer_.set("N");
}

void QUARVOAnnuler::pointer_pieces(Evt* evt) {
  if (vPointer_.text() == "O") return;
  appelInterne("POINTER_PIECES_CF", evt);
  appelInterne("POINTER_PIECES_BF", evt);
  appelInterne("POINTER_PIECES_FF", evt);
  vPointer_.set("O");
}

void QUARVOAnnuler::pointer_pieces_cf(Evt* evt) {
  listerPieces(evt, kCommandes);
}
void QUARVOAnnuler::pointer_pieces_bf(Evt* evt) {
  listerPieces(evt, kReceptions);
}
void QUARVOAnnuler::pointer_pieces_ff(Evt* evt) {
  listerPieces(evt, kFactures);
}

void QUARVOAnnuler::listerPieces(Evt* evt, const Sorte& sorte) {
  if (vTypePiece_.text() != "T" && vTypePiece_.text() != sorte.lettre) return;
  Table& header = *tableParContexte(std::string("CTX_") + sorte.entete);
  Table& lines = *tableParContexte(std::string("CTX_") + sorte.lignes);
  // Each step shows at once: the waiting box is the screen's, not queued after the handler.
  appeler(*this, "COMMUN", "BOITE_AFFICHER_TITRE", {val(sorte.titre)});
  vJauge1_.set(0.0);
  vJauge2_.set(0.0);
  vEComposant_.set(sorte.entete);
  vLComposant_.set(sorte.lignes);

  header.effacerCriteres();
  header.ajouterCritere("DATE_CREATION", '+', vdatemin_.value(), 'D');
  // No end date is no upper bound: an empty date would keep only the undated pieces.
  if (!vdatemax_.date().empty())
    header.ajouterCritere("DATE_CREATION", '-', vdatemax_.value(), 'D');
  header.verrouiller('E');
  if (!vNumMin_.text().empty()) header.ajouterCritere("NUMERO_DOC", '+', vNumMin_.value(), 'A');
  if (!vNumMax_.text().empty()) header.ajouterCritere("NUMERO_DOC", '-', vNumMax_.value(), 'A');
  vJauge2_.set(static_cast<double>(header.compter()));
  header.ouvrir();
  while (header.lire(1) == 0) {
    appeler(*this, "COMMUN", "BOITE_AFFICHER_LIBELLE",
            {val(std::string(sorte.libelle) + header.valeur("NUMERO_DOC").toChaine())});
    vJauge1_.set(vJauge1_.dbl() + 1);
    appeler(*this, "COMMUN", "BOITE_AFFICHER_JAUGE", {vJauge1_.value(), vJauge2_.value()});
    if (!vaffaCode_.text().empty() && !appartientALAffaire(header, lines)) continue;

    std::string ident = header.valeur("IDENT").toChaine();
    quarvo2_.effacerCriteres();
    quarvo2_.ajouterCritere(lienComposant_.name(), '=', Valeur::chaine(sorte.entete));
    quarvo2_.ajouterCritere(lienComposantIdent_.name(), '=', Valeur::chaine(ident));
    quarvo2_.verrouiller('E');
    if (quarvo2_.lire(3) != 0) continue;  // not linked: nothing to cancel
    appelInterne("CREER_EAPPR", evt);
    if (erreurMethode() == 0) eappr_.inserer();
  }
  appeler(*this, "COMMUN", "BOITE_SORTIR");
}

bool QUARVOAnnuler::appartientALAffaire(Table& header, Table& lines) {
  std::string section = header.valeur("SECAN_CODE").toChaine();
  // A section on the header decides, whatever the lines say.
  if (!section.empty()) return section == vaffaCode_.text();
  vFlag_.set(int64_t{0});
  lines.chercher(3, "NUMERO", '/', Valeur::chaine(header.valeur("IDENT").toChaine() + "|"));
  lines.ouvrir();
  while (lines.lire(1) == 0) {
    std::string code = lines.valeur("SECAN_CODE").toChaine();
    if (!code.empty() && code == vaffaCode_.text()) {
      vFlag_.set(int64_t{1});
      break;
    }
  }
  return vFlag_.entier() == 1;
}

void QUARVOAnnuler::creer_eappr(Evt* evt) {
  erreurMethode(0, evt);
  eappr_.preparer();
  Monnaie ht = toMonnaie(entete("HT"));
  if (vEComposant_.text() == "GAPEFAC" && entete("TYPE").toChaine() == "A") ht = -ht;
  eIdent_.set(vEComposant_.text() + "|" + entete("NUMERO_DOC").toChaine());
  eComposant_.set(vEComposant_.value());
  eComposantIdent_.set(entete("IDENT"));
  ePiece_.set(entete("NUMERO_DOC"));
  eDatePiece_.set(Valeur::date(toDate(entete("DATE_CREATION"))));
  eHt_.set(ht);
  eImputation_.set("O");
}

void QUARVOAnnuler::lst_selection(Evt* evt) {
  vEComposant_.assign(eComposant_.valeur());
  std::string composant = vEComposant_.text();
  std::string piece = ePiece_.text();
  appeler(*this, composant, "LECTURE", {eComposantIdent_.valeur()});
  vPiece_.set(frame::legendePiece(composant, piece, factureType_.text()));
  if (auto fournisseur = Execute::execute(*this, "I_" + composant + ".GCPFOUR_IDENT")) {
    appeler(*this, "GCPFOUR", "LECTURE", {*fournisseur});
  }
  erreurMethode(0, evt);
}

void QUARVOAnnuler::lst_c5(Evt* evt) {
  std::string marque = eImputation_.text();
  if (marque != "O" && marque != "N") {
    BoiteDialogue("Attention",
                  "Tapez O pour annuler les imputations de la pièce, N pour les garder.", 0,
                  {"$1~OK"});
    controler("LST_C5");
    rejeter(evt);
    return;
  }
  eappr_.modifier();
  afficherListe("LST");
}

// ---- Validation ----

void QUARVOAnnuler::validation(Evt* evt) {
  if (!frame::messageOn(*this, vChoix_, "86")) {
    rejeter(evt);
    return;
  }
  for (const char* control : {"LST", "RECULER", "ABAND", "VALID", "TERMINE"}) interdire(control);
  appelInterne("ANNULER_PIECES", evt);
  autoriser("TERMINE");
  erreurMethode(0, evt);
}

void QUARVOAnnuler::apres_validation(Evt*) {}

void QUARVOAnnuler::annuler_pieces(Evt* evt) {
  eappr_.effacerCriteres();
  eappr_.ajouterCritere(eImputation_.name(), '=', Valeur::chaine("O"));
  eappr_.ouvrir();
  while (eappr_.lire(1) == 0) {
    EvtParamVal piece{eComposant_.valeur(), eComposantIdent_.valeur()};
    appelerModule("", "QUARVO", "QUARVO-ANNULER1", &piece);
  }
  // The list shows every row again.
  eappr_.effacerCriteres();
  erreurMethode(0, evt);
}

// ---- Leaving ----

void QUARVOAnnuler::aband(Evt* evt) {
  appelInterne("SORTIE_ECRAN", evt);
}

void QUARVOAnnuler::sortie_ecran(Evt* evt) {
  appelInterne("TERMINE", evt);
  sortir();
}

void QUARVOAnnuler::termine(Evt*) {
  // The list is this screen's work: nothing of it outlives the window.
  eappr_.effacerCriteres();
  eappr_.supprimerTout();
  sortir();
}

void QUARVOAnnuler::fermer() {
  EvtParamVal none;
  raise("SORTIE_ECRAN", &none);
}

}  // namespace quarvo
