#include "quarvo/imputation/QUARVOPointer_pieces.h"

#include "host/Execute.h"
#include "host/session/Session.h"
#include "host/table/Database.h"
#include "quarvo/frame/Appels.h"
#include "quarvo/frame/Apports.h"
#include "quarvo/frame/PieceKinds.h"

namespace quarvo {

using namespace host;
using frame::appeler;

namespace {

const frame::SorteSelection& kCommandes = frame::kCommandesSelection;
const frame::SorteSelection& kReceptions = frame::kReceptionsSelection;
const frame::SorteSelection& kFactures = frame::kFacturesSelection;

}  // namespace

QUARVOPointer_pieces::QUARVOPointer_pieces(Evt* evt)
    : Traitmnt(evt),
      vDateMin_(chaine("VDATEMIN")),
      vDateMax_(chaine("VDATEMAX")),
      vTypePiece_(chaine("VTYPE_PIECE")),
      vArbitrage_(entier("VARBITRAGE")),
      vNumMin_(chaine("VNUMMIN")),
      vNumMax_(chaine("VNUMMAX")),
      vAffaCode_(chaine("VAFFA_CODE")),
      mo_(chaine("MO")),
      an_(chaine("AN")),
      vDateFin_(date("V_DATE_FIN")),
      vEtatPiece_(chaine("V_ETAT_PIECE")),
      vEComposant_(chaine("V_ECOMPOSANT")),
      vLComposant_(chaine("V_LCOMPOSANT")),
      vSecanCode_(chaine("V_SECAN_CODE")),
      vErreur_(entier("V_ERREUR")),
      vNbVentil_(declare(Kind::Simple, "V_NB_VENTIL", "", Valeur::simple(0))),
      vFlag_(entier("V_FLAG")),
      vJauge1_(dbl("V_JAUGE1")),
      vJauge2_(dbl("V_JAUGE2")),
      vCritereAchat_(chaine("V_CRITERE_ACHAT")),
      vPrestationIdent_(chaine("V_PRESTATION_IDENT")),
      vAflbudIdent_(chaine("V_AFLBUD_IDENT")),
      quarvo2_(this, "VOVOVA", "QUARVO", "QUARVO2"),
      gapecom_(this, "GESCOM", "GAPECOM", "CTX_GAPECOM"),
      gapebl_(this, "GESCOM", "GAPEBL", "CTX_GAPEBL"),
      gapefac_(this, "GESCOM", "GAPEFAC", "CTX_GAPEFAC"),
      gaplcom_(this, "GESCOM", "GAPLCOM", "CTX_GAPLCOM"),
      gaplbl_(this, "GESCOM", "GAPLBL", "CTX_GAPLBL"),
      gaplfac_(this, "GESCOM", "GAPLFAC", "CTX_GAPLFAC"),
      iAfpara_(this, "VOVOVA", "I_AFPARA", ""),
      iAfsoci_(this, "VOVOVA", "I_AFSOCI", ""),
      afebud_(this, "VOVOVA", "AFEBUD", ""),
      aflbud_(this, "VOVOVA", "AFLBUD", ""),
      iAfaffa_(this, "VOVOVA", "I_AFAFFA", ""),
      iGcpartic_(this, "VOVOVA", "I_GCPARTIC", ""),
      iAfpres_(this, "VOVOVA", "I_AFPRES", ""),
      eappr_(this, "VOVOVA", "M_EAPPR", ""),
      lappr_(this, "VOVOVA", "M_LAPPR", ""),
      vappr_(this, "VOVOVA", "M_VAPPR", "") {
  lierParametres(evt, {{&vDateMin_, 0},
                       {&vDateMax_, 0},
                       {&vTypePiece_, 0},
                       {&vArbitrage_, 0},
                       {&vNumMin_, 0},
                       {&vNumMax_, 0},
                       {&vAffaCode_, 0}});
  nomBase("VOVOVA");
  addBranch("DEBUT", [this](Evt* e) { debut(e); });
  addBranch("FAIRE", [this](Evt* e) { faire(e); });
  addBranch("POINTER_PIECES_CF", [this](Evt* e) { pointer_pieces_cf(e); });
  addBranch("POINTER_PIECES_BF", [this](Evt* e) { pointer_pieces_bf(e); });
  addBranch("POINTER_PIECES_FF", [this](Evt* e) { pointer_pieces_ff(e); });
  addBranch("CREER_EAPPR", [this](Evt* e) { creer_eappr(e); });
  addBranch("CREER_LAPPR", [this](Evt* e) { creer_lappr(e); });
  addBranch("MODIFIER_LAPPR", [this](Evt* e) { modifier_lappr(e); });
  addBranch("MODIFIER_EAPPR", [this](Evt* e) { modifier_eappr(e); });
  addBranch("POINTER_BUDGETS", [this](Evt* e) { pointer_budgets(e); });
  addBranch("POINTER_PRESTATION", [this](Evt* e) { pointer_prestation(e); });
  addBranch("CREER_VAPPR", [this](Evt* e) { creer_vappr(e); });
  addBranch("CREER_AFLBUD", [this](Evt* e) { creer_aflbud(e); });
}

Valeur QUARVOPointer_pieces::entete(const std::string& column) {
  auto v = Execute::execute(*this, "CTX_" + vEComposant_.text() + "." + column);
  return v ? *v : Valeur();
}

Valeur QUARVOPointer_pieces::ligne(const std::string& column) {
  auto v = Execute::execute(*this, "CTX_" + vLComposant_.text() + "." + column);
  return v ? *v : Valeur();
}

bool QUARVOPointer_pieces::appelInterne(const std::string& label, Evt* evt) {
  appelerProcedure("", "", "", label, evt, 0);
  return erreurMethode() == 0;
}

std::string QUARVOPointer_pieces::clePiece() {
  return vEComposant_.text() + "|" + entete("IDENT").toChaine();
}

std::string QUARVOPointer_pieces::cleLigne() {
  return vEComposant_.text() + "|" + ligne("NUMERO").toChaine();
}

void QUARVOPointer_pieces::debut(Evt* evt) {
  if (appeler(*this, "AFSOCI", "LECTURE_CODE", {val("SOCIETE")}) != 0) {
    erreurMethode(1, evt);
    sortir(nullptr, 0);
    return;
  }
  vCritereAchat_.set("0");
  if (appeler(*this, "AFPARA", "LECTURE_CODE", {val("MACHAT")}) == 0 &&
      toEntier(iAfpara_.valeur("PARAM3")) == 1) {
    vCritereAchat_.assign(iAfpara_.valeur("PARAM1"));
  }
  std::string period = iAfsoci_.valeur("MOIS_ANNEE").toChaine();
  mo_.set(period.substr(0, 2));
  an_.set(period.size() >= 6 ? period.substr(2, 4) : "");
  auto first = Date::parse("01/" + mo_.text() + "/" + an_.text());
  vDateFin_.set(first ? first->lastOfMonth() : Date());
  // The work tables are read by key: piece, piece line, budget allocation.
  session().memoire("M_EAPPR").setKey({"IDENT"});
  session().memoire("M_LAPPR").setKey({"NUMERO"});
  session().memoire("M_VAPPR").setKey({"IDENT"});
}

void QUARVOPointer_pieces::faire(Evt* evt) {
  appelerProcedure("", "", "", "POINTER_PIECES_CF", evt, 0);
  appelerProcedure("", "", "", "POINTER_PIECES_BF", evt, 0);
  appelerProcedure("", "", "", "POINTER_PIECES_FF", evt, 0);
  erreurMethode(0, evt);
  sortir(nullptr, 0);
}

void QUARVOPointer_pieces::pointer_pieces_cf(Evt* evt) {
  pointerPieces(evt, kCommandes);
}
void QUARVOPointer_pieces::pointer_pieces_bf(Evt* evt) {
  pointerPieces(evt, kReceptions);
}
void QUARVOPointer_pieces::pointer_pieces_ff(Evt* evt) {
  pointerPieces(evt, kFactures);
}

void QUARVOPointer_pieces::pointerPieces(Evt* evt, const Sorte& sorte) {
  if (vTypePiece_.text() != "T" && vTypePiece_.text() != sorte.lettre) return;
  sorte_ = &sorte;
  entete_ = tableParContexte(std::string("CTX_") + sorte.entete);
  lignes_ = tableParContexte(std::string("CTX_") + sorte.lignes);
  appeler(*this, "COMMUN", "BOITE_AFFICHER_TITRE", {val(sorte.titre)});
  vJauge1_.set(0.0);
  vJauge2_.set(0.0);
  vEComposant_.set(sorte.entete);
  vLComposant_.set(sorte.lignes);

  Table& header = *entete_;
  header.effacerCriteres();
  header.ajouterCritere("DATE_CREATION", '+', vDateMin_.value(), 'D');
  header.ajouterCritere("DATE_CREATION", '-', vDateMax_.value(), 'D');
  header.verrouiller('E');
  if (!vNumMin_.text().empty()) header.ajouterCritere("NUMERO_DOC", '+', vNumMin_.value(), 'A');
  if (!vNumMax_.text().empty()) header.ajouterCritere("NUMERO_DOC", '-', vNumMax_.value(), 'A');
  vJauge2_.set(static_cast<double>(header.compter()));
  header.ouvrir();
  while (header.lire(1) == 0) {
    // One piece at a time, each in a transaction of its own: its cancellation, analysis and
    // any budget line created for it are kept together, and reads need no lock of their own.
    Transaction piece(session().db());
    pointerPiece(evt, sorte, header);
    piece.commit();
  }
  appeler(*this, "COMMUN", "BOITE_SORTIR");
}

void QUARVOPointer_pieces::pointerPiece(Evt* evt, const Sorte& sorte, Table& header) {
  bool option8 = iAfsoci_.valeur("OPTION8").toChaine() == "O";
  appeler(*this, "COMMUN", "BOITE_AFFICHER_LIBELLE",
          {val(std::string(sorte.libelle) + header.valeur("NUMERO_DOC").toChaine())});
  vJauge1_.set(vJauge1_.dbl() + 1);
  appeler(*this, "COMMUN", "BOITE_AFFICHER_JAUGE", {vJauge1_.value(), vJauge2_.value()});

  if (!option8 && header.valeur("VALIDEE").toChaine() != "1") return;
  Date created = toDate(header.valeur("DATE_CREATION"));
  if (!vDateFin_.date().empty() && vDateFin_.date() < created) return;
  std::string ident = header.valeur("IDENT").toChaine();
  std::string headerProject = header.valeur("SECAN_CODE").toChaine();
  if (!vAffaCode_.text().empty()) {
    if (!headerProject.empty()) {
      if (headerProject != vAffaCode_.text()) return;
    } else {
      vFlag_.set(int64_t{0});
      lignes_->chercher(3, "NUMERO", '/', Valeur::chaine(ident + "|"));
      lignes_->ouvrir();
      while (lignes_->lire(1) == 0) {
        std::string code = lignes_->valeur("SECAN_CODE").toChaine();
        if (!code.empty() && code == vAffaCode_.text()) {
          vFlag_.set(int64_t{1});
          break;
        }
      }
      if (vFlag_.entier() == 0) return;
    }
  }

  // Linked before and unchanged since: nothing to do. A piece changed since it was linked is
  // pointed again; its old links are cancelled by the writer, in the transaction that writes the
  // new ones, so that the pointing (and a proposal abandoned after it) changes nothing.
  quarvo2_.effacerCriteres();
  quarvo2_.ajouterCritere("COMPOSANT", '=', Valeur::chaine(sorte.entete));
  quarvo2_.ajouterCritere("COMPOSANT_IDENT", '=', Valeur::chaine(ident));
  quarvo2_.verrouiller('E');
  if (quarvo2_.lire(3) == 0) {
    std::string linked =
        toDate(quarvo2_.valeur("DATE_MAJ")).text() + quarvo2_.valeur("HEURE_MAJ").toChaine();
    std::string current =
        toDate(header.valeur("DATE_MAJ")).text() + header.valeur("HEURE_MAJ").toChaine();
    if (linked == current) return;
  }

  vEtatPiece_.set("0");
  appeler(*this, "QUARVO", "ANALYSER",
          {val(sorte.entete), val(ident), val(1), val(""), ref(vEtatPiece_)});

  if (!appelInterne("CREER_EAPPR", evt)) return;
  eappr_.inserer();

  lignes_->chercher(3, "NUMERO", '/', Valeur::chaine(ident + "|"));
  lignes_->ouvrir();
  while (lignes_->lire(1) == 0) {
    Valeur article = lignes_->valeur("GCPARTIC_IDENT");
    if (article.toChaine().empty()) continue;
    if (appeler(*this, "GCPARTIC", "LECTURE", {article}) != 0) continue;
    prestation_.reset();
    vSecanCode_.set(headerProject);
    std::string lineProject = lignes_->valeur("SECAN_CODE").toChaine();
    if (!lineProject.empty()) vSecanCode_.set(lineProject);
    if (!appelInterne("CREER_LAPPR", evt)) continue;
    lappr_.inserer();
    appelerProcedure("", "", "", "POINTER_BUDGETS", evt, 0);
    if (appelInterne("MODIFIER_LAPPR", evt)) lappr_.modifier();
  }
  if (appelInterne("MODIFIER_EAPPR", evt)) eappr_.modifier();
}

void QUARVOPointer_pieces::creer_eappr(Evt* evt) {
  erreurMethode(0, evt);
  vErreur_.set(int64_t{0});
  eappr_.preparer();
  Monnaie ht = toMonnaie(entete("HT"));
  if (vEComposant_.text() == "GAPEFAC" && entete("TYPE").toChaine() == "A") ht = -ht;
  eappr_.ecrire("IDENT", Valeur::chaine(clePiece()));
  eappr_.ecrire("COMPOSANT", vEComposant_.value());
  eappr_.ecrire("COMPOSANT_IDENT", entete("IDENT"));
  eappr_.ecrire("PIECE", entete("NUMERO_DOC"));
  eappr_.ecrire("DATE_PIECE", Valeur::date(toDate(entete("DATE_CREATION"))));
  eappr_.ecrire("HT", Valeur::monnaie(ht));
  eappr_.ecrire("DATE_MAJ", Valeur::date(toDate(entete("DATE_MAJ"))));
  eappr_.ecrire("HEURE_MAJ", entete("HEURE_MAJ"));
  eappr_.ecrire("IMPUTATION", Valeur::chaine("O"));
  eappr_.ecrire("ERREUR", Valeur::entier(0));
}

void QUARVOPointer_pieces::creer_lappr(Evt* evt) {
  erreurMethode(0, evt);
  lappr_.preparer();
  lappr_.ecrire("NUMERO", Valeur::chaine(cleLigne()));
  lappr_.ecrire("COMPOSANT", vLComposant_.value());
  lappr_.ecrire("COMPOSANT_IDENT", ligne("IDENT"));
  lappr_.ecrire("GCPARTIC_CODE", ligne("GCPARTIC_CODE"));
  lappr_.ecrire("DESIG", ligne("DESIG"));

  // What the line contributes: the rule every path that links a piece shares.
  auto colonneEntete = [this](const std::string& c) { return entete(c); };
  auto colonneLigne = [this](const std::string& c) { return ligne(c); };
  frame::ApportLigne apport = frame::apportLigne(
      frame::enteteAchat(vEComposant_.text(), colonneEntete), frame::ligneAchat(colonneLigne));
  lappr_.ecrire("PUHT", Valeur::monnaie(apport.puht));
  lappr_.ecrire("QTE", Valeur::dbl(apport.qte));
  lappr_.ecrire("QTT", Valeur::dbl(apport.qtt));
  lappr_.ecrire("HT", Valeur::monnaie(apport.ht));
  lappr_.ecrire("SECAN_CODE", vSecanCode_.value());
  lappr_.ecrire("ERREUR", Valeur::entier(0));
}

void QUARVOPointer_pieces::pointer_budgets(Evt*) {
  // A piece the analysis refused is not pointed, and its lines are in error.
  if (vEtatPiece_.text() != "0") {
    vNbVentil_.set(0.0);
    return;
  }
  vNbVentil_.set(0.0);
  if (appeler(*this, "AFAFFA", "LECTURE_CODE", {vSecanCode_.value()}) != 0) return;
  bool arbitrage = vArbitrage_.entier() == 1;
  afebud_.chercher(3, "AFAFFA_IDENT", '=', iAfaffa_.valeur("IDENT"));
  afebud_.ouvrir();
  while (afebud_.lire(1) == 0) {
    if (afebud_.valeur("CODE_ETAT").toChaine() == "C") continue;
    aflbud_.chercher(3, "NUMERO", '/', Valeur::chaine(afebud_.valeur("IDENT").toChaine() + "|"));
    aflbud_.ouvrir();
    while (aflbud_.lire(1) == 0) {
      std::string service = aflbud_.valeur("AFPRES_IDENT").toChaine();
      if (service.empty()) continue;
      if (servicesLus_.count(service) == 0) {
        if (appeler(*this, "AFPRES", "LECTURE", {val(service)}) != 0) continue;
        servicesLus_.insert(service);
      }
      if (!appelInterne("POINTER_PRESTATION", nullptr)) continue;
      vNbVentil_.set(vNbVentil_.dbl() + 1);
      if (appelInterne("CREER_VAPPR", nullptr)) vappr_.inserer();
      if (arbitrage && vNbVentil_.dbl() == 1) break;
    }
    if (!arbitrage) continue;
    if (vNbVentil_.dbl() == 0) {
      appelerProcedure("", "", "", "CREER_AFLBUD", nullptr, 0);
      vNbVentil_.set(1.0);
      if (appelInterne("CREER_VAPPR", nullptr)) vappr_.inserer();
    }
    return;
  }
}

std::optional<std::string> QUARVOPointer_pieces::prestationDeLArticle() {
  if (!prestation_) {
    vPrestationIdent_.set("");
    int rc = appeler(*this, "AFPARA", "REGROUPEMENT_ACHAT",
                     {vCritereAchat_.value(), iGcpartic_.valeur("IDENT"),
                      iGcpartic_.valeur("GCPCRIT1_IDENT"), iGcpartic_.valeur("GCPCRIT2_IDENT"),
                      iGcpartic_.valeur("GCPCRIT3_IDENT"), ref(vPrestationIdent_)});
    prestation_ = rc == 0 ? std::optional<std::string>(vPrestationIdent_.text()) : std::nullopt;
  }
  vPrestationIdent_.set(prestation_->value_or(""));
  return *prestation_;
}

void QUARVOPointer_pieces::pointer_prestation(Evt* evt) {
  erreurMethode(0, evt);
  auto service = prestationDeLArticle();
  bool suits = service && *service == aflbud_.valeur("AFPRES_IDENT").toChaine();
  erreurMethode(suits ? 0 : 1, evt);
}

void QUARVOPointer_pieces::creer_vappr(Evt* evt) {
  erreurMethode(0, evt);
  bool first = vNbVentil_.dbl() <= 1;
  Valeur qte = first ? lappr_.valeur("QTE") : Valeur::dbl(0.0);
  vappr_.preparer();
  vappr_.ecrire("IDENT", Valeur::chaine(vLComposant_.text() + "|" + ligne("IDENT").toChaine()));
  vappr_.ecrire("COMPOSANT", vLComposant_.value());
  vappr_.ecrire("COMPOSANT_IDENT", ligne("IDENT"));
  vappr_.ecrire("AFAFFA_IDENT", iAfaffa_.valeur("IDENT"));
  vappr_.ecrire("AFEBUD_IDENT", afebud_.valeur("IDENT"));
  vappr_.ecrire("AFLBUD_IDENT", aflbud_.valeur("IDENT"));
  vappr_.ecrire("QTE", Valeur::dbl(toDouble(qte)));
  vappr_.ecrire("HT", Valeur::monnaie(first ? toMonnaie(lappr_.valeur("HT")) : Monnaie()));
  vappr_.ecrire("QTT", Valeur::dbl(toDouble(lappr_.valeur("QTT"))));
  vappr_.ecrire("QTE0", Valeur::dbl(toDouble(qte)));
}

void QUARVOPointer_pieces::creer_aflbud(Evt* evt) {
  erreurMethode(0, evt);
  auto service = prestationDeLArticle();
  if (!service || appeler(*this, "AFPRES", "LECTURE", {ref(vPrestationIdent_)}) != 0) {
    erreurMethode(1, evt);
    return;
  }
  Field& ident = vAflbudIdent_;
  if (!frame::numeroter(*this, "VOVOVA", "AFLBUD", ident)) {
    erreurMethode(1, evt);
    return;
  }
  aflbud_.preparer();
  aflbud_.ecrire("IDENT", ident.value());
  aflbud_.ecrire("NUMERO", Valeur::chaine(afebud_.valeur("IDENT").toChaine() + "|"));
  aflbud_.ecrire("AFEBUD_IDENT", afebud_.valeur("IDENT"));
  aflbud_.ecrire("AFAFFA_IDENT", afebud_.valeur("AFAFFA_IDENT"));
  aflbud_.ecrire("AFAFFA_CODE", afebud_.valeur("AFAFFA_CODE"));
  aflbud_.ecrire("DATE_DEBUT", afebud_.valeur("DATE_DEBUT"));
  aflbud_.ecrire("DATE_FIN", afebud_.valeur("DATE_FIN"));
  aflbud_.ecrire("AFEBUD_PIECE", afebud_.valeur("PIECE"));
  aflbud_.ecrire("AFPRES_IDENT", iAfpres_.valeur("IDENT"));
  aflbud_.ecrire("AFPRES_CODE", iAfpres_.valeur("CODE"));
  aflbud_.ecrire("DESIG", iAfpres_.valeur("DESIG"));
  aflbud_.ecrire("UNITE", iAfpres_.valeur("UNITE"));
  aflbud_.ecrire("APPRO", Valeur::chaine("A"));
  erreurMethode(aflbud_.inserer(), evt);
}

void QUARVOPointer_pieces::modifier_lappr(Evt* evt) {
  erreurMethode(0, evt);
  if (lappr_.chercher(3, "NUMERO", '=', Valeur::chaine(cleLigne())) != 0) {
    erreurMethode(1, evt);
    return;
  }
  if (vNbVentil_.dbl() != 1) {
    lappr_.ecrire("ERREUR", Valeur::entier(1));
    vErreur_.set(int64_t{1});
  }
}

void QUARVOPointer_pieces::modifier_eappr(Evt* evt) {
  erreurMethode(0, evt);
  if (eappr_.chercher(3, "IDENT", '=', Valeur::chaine(clePiece())) != 0) {
    erreurMethode(1, evt);
    return;
  }
  eappr_.ecrire("ERREUR", vErreur_.value());
  if (vErreur_.entier() != 0) eappr_.ecrire("IMPUTATION", Valeur::chaine("N"));
}

}  // namespace quarvo
