#include "quarvo/analysis/QUARVOAnalyser.h"

#include <cmath>
#include <optional>
#include <string_view>

#include "host/Execute.h"
#include "host/UException.h"
#include "host/session/Session.h"
#include "host/table/Database.h"
#include "host/value/Identifiant.h"

namespace quarvo {

using namespace host;

struct QUARVOAnalyser::Kind {
  std::string_view header;       // "PCOMPOSANT": the header table
  std::string_view lines;        // the line table
  std::string_view headerLabel;  // own label of the header step
  std::string_view lineLabel;    // own label of the line loop
  std::string_view labelKey;     // caption of the piece, "$1" standing for its number
  Table QUARVOAnalyser::*headerTable;
  Champ QUARVOAnalyser::*headerIdent;
  Table QUARVOAnalyser::*lineTable;
  Champ QUARVOAnalyser::*lineNumero;
  Champ QUARVOAnalyser::*lineArticle;
  Champ QUARVOAnalyser::*lineHt;
};

const QUARVOAnalyser::Kind QUARVOAnalyser::kKinds[] = {
    {"GAPECOM", "GAPLCOM", "ANALYSER_GAPECOM", "ANALYSER_GAPLCOM", "GAPECOM_NO",
     &QUARVOAnalyser::gapecom_, &QUARVOAnalyser::gapecomIdent_, &QUARVOAnalyser::gaplcom_,
     &QUARVOAnalyser::gaplcomNumero_, &QUARVOAnalyser::gaplcomArticle_,
     &QUARVOAnalyser::gaplcomHt_},
    {"GAPEBL", "GAPLBL", "ANALYSER_GAPEBL", "ANALYSER_GAPLBL", "GAPEBL_NO",
     &QUARVOAnalyser::gapebl_, &QUARVOAnalyser::gapeblIdent_, &QUARVOAnalyser::gaplbl_,
     &QUARVOAnalyser::gaplblNumero_, &QUARVOAnalyser::gaplblArticle_, &QUARVOAnalyser::gaplblHt_},
    {"GAPEFAC", "GAPLFAC", "ANALYSER_GAPEFAC", "ANALYSER_GAPLFAC", "GAPEFAC_NO",
     &QUARVOAnalyser::gapefac_, &QUARVOAnalyser::gapefacIdent_, &QUARVOAnalyser::gaplfac_,
     &QUARVOAnalyser::gaplfacNumero_, &QUARVOAnalyser::gaplfacArticle_,
     &QUARVOAnalyser::gaplfacHt_},
};

const QUARVOAnalyser::Kind* QUARVOAnalyser::kindOf(const std::string& headerTable) {
  for (const Kind& k : kKinds) {
    if (k.header == headerTable) return &k;
  }
  return nullptr;
}

namespace {
// Attempts at numbering an error row when other rows took the numbers meanwhile.
constexpr int kEssaisNumero = 3;
}  // namespace

QUARVOAnalyser::QUARVOAnalyser(Evt* evt)
    : Traitmnt(evt),
      pcomposant_(chaine("PCOMPOSANT")),
      pcomposantIdent_(chaine("PCOMPOSANT_IDENT")),
      pMuet_(entier("P_MUET")),
      pObjet_(chaine("P_OBJET")),
      pErreur_(chaine("P_ERREUR")),
      vtrf_(chaine("VTRF")),
      vmachat_(chaine("VMACHAT")),
      vnumjl_(chaine("VNUMJL")),
      vEcomposant_(chaine("V_ECOMPOSANT")),
      vLcomposant_(chaine("V_LCOMPOSANT")),
      vcsect_(chaine("VCSECT")),
      vnumcp_(chaine("VNUMCP")),
      vcpost_(chaine("VCPOST")),
      vmt_(monnaie("VMT")),
      vrem_(monnaie("VREM")),
      vesc_(monnaie("VESC")),
      vLibel_(chaine("V_LIBEL")),
      vLibPiece_(chaine("V_LIB_PIECE")),
      pIdent_(dbl("P_IDENT")),
      pCompo_(chaine("P_COMPO")),
      pCode_(chaine("P_CODE")),
      pDesig_(chaine("P_DESIG")),
      pCmt_(chaine("P_CMT")),
      pMessage1_(chaine("P_MESSAGE1")),
      pMessage2_(chaine("P_MESSAGE2")),
      gapecom_(this, "GESCOM", "GAPECOM", "GAPECOM"),
      gaplcom_(this, "GESCOM", "GAPLCOM", "GAPLCOM"),
      gapebl_(this, "GESCOM", "GAPEBL", "GAPEBL"),
      gaplbl_(this, "GESCOM", "GAPLBL", "GAPLBL"),
      gapefac_(this, "GESCOM", "GAPEFAC", "GAPEFAC"),
      gaplfac_(this, "GESCOM", "GAPLFAC", "GAPLFAC"),
      iAfsoci_(this, "VOVOVA", "I_AFSOCI", ""),
      immErreur_(this, "VOVOVA", "IMM_ERREUR", ""),
      iGcpparam_(this, "VOVOVA", "I_GCPPARAM", ""),
      iGcpfour_(this, "VOVOVA", "I_GCPFOUR", ""),
      iGcpartic_(this, "VOVOVA", "I_GCPARTIC", ""),
      iAfcomp_(this, "VOVOVA", "I_AFCOMP", ""),
      gapecomIdent_("IDENT", gapecom_),
      gaplcomNumero_("NUMERO", gaplcom_),
      gaplcomArticle_("GCPARTIC_CODE", gaplcom_),
      gaplcomHt_("HT", gaplcom_),
      gapeblIdent_("IDENT", gapebl_),
      gaplblNumero_("NUMERO", gaplbl_),
      gaplblArticle_("GCPARTIC_CODE", gaplbl_),
      gaplblHt_("HT", gaplbl_),
      gapefacIdent_("IDENT", gapefac_),
      gaplfacNumero_("NUMERO", gaplfac_),
      gaplfacArticle_("GCPARTIC_CODE", gaplfac_),
      gaplfacHt_("HT", gaplfac_),
      liaisonC_("LIAISON_C", iAfsoci_),
      erreurIdent_("IDENT", immErreur_),
      erreurComposant_("COMPOSANT", immErreur_),
      erreurCode_("CODE", immErreur_),
      erreurDesig_("DESIG", immErreur_),
      erreurCmt_("CMT", immErreur_),
      saisieAnaA_("SAISIE_ANA_A", iGcpparam_),
      gapffouIdent_("GAPFFOU_IDENT", iGcpfour_),
      gcpcrit1Ident_("GCPCRIT1_IDENT", iGcpartic_),
      gcpcrit2Ident_("GCPCRIT2_IDENT", iGcpartic_),
      gcpcrit3Ident_("GCPCRIT3_IDENT", iGcpartic_),
      cpost_("CPOST", iAfcomp_) {
  lierParametres(
      evt,
      {{&pcomposant_, 0}, {&pcomposantIdent_, 0}, {&pMuet_, 0}, {&pObjet_, 0}, {&pErreur_, 1}});
  nomBase("VOVOVA");
  addBranch("DEBUT_ATTENTE", [this](Evt* e) { debut_attente(e); });
  addBranch("STOP_ATTENTE", [this](Evt* e) { stop_attente(e); });
  addBranch("VALEUR_ATTENTE", [this](Evt* e) { valeur_attente(e); });
  addBranch("FIN_ATTENTE", [this](Evt* e) { fin_attente(e); });
  addBranch("ABANDON_ATTENTE", [this](Evt* e) { abandon_attente(e); });
  addBranch("DEBUT", [this](Evt* e) { debut(e); });
  addBranch("FAIRE", [this](Evt* e) { faire(e); });
  addBranch("ANALYSER_GAPECOM", [this](Evt* e) { analyser_gapecom(e); });
  addBranch("ANALYSER_GAPLCOM", [this](Evt* e) { analyser_gaplcom(e); });
  addBranch("ANALYSER_GAPEBL", [this](Evt* e) { analyser_gapebl(e); });
  addBranch("ANALYSER_GAPLBL", [this](Evt* e) { analyser_gaplbl(e); });
  addBranch("ANALYSER_GAPEFAC", [this](Evt* e) { analyser_gapefac(e); });
  addBranch("ANALYSER_GAPLFAC", [this](Evt* e) { analyser_gaplfac(e); });
  addBranch("ANALYSER_ENTETE", [this](Evt* e) { analyser_entete(e); });
  addBranch("ANALYSER_LIGNE", [this](Evt* e) { analyser_ligne(e); });
  addBranch("ANALYSER_PIED", [this](Evt* e) { analyser_pied(e); });
  addBranch("COMPTE_ACHAT", [this](Evt* e) { compte_achat(e); });
  addBranch("CRITERE_REGROUPEMENT_A", [this](Evt* e) { critere_regroupement_a(e); });
  addBranch("LECTURE_COMPTE", [this](Evt* e) { lecture_compte(e); });
  addBranch("ECRIRE_ERREUR", [this](Evt* e) { ecrire_erreur(e); });
}

// The analysis shows no waiting box of its own: every box event is abandoned.
void QUARVOAnalyser::debut_attente(Evt* evt) {
  abandon_attente(evt);
}
void QUARVOAnalyser::stop_attente(Evt* evt) {
  abandon_attente(evt);
}
void QUARVOAnalyser::valeur_attente(Evt* evt) {
  abandon_attente(evt);
}
void QUARVOAnalyser::fin_attente(Evt* evt) {
  abandon_attente(evt);
}
void QUARVOAnalyser::abandon_attente(Evt*) {}

Valeur QUARVOAnalyser::entete(const std::string& column) {
  return Execute::execute(*this, vEcomposant_.text() + "." + column).value_or(Valeur());
}

Valeur QUARVOAnalyser::ligne(const std::string& column) {
  return Execute::execute(*this, vLcomposant_.text() + "." + column).value_or(Valeur());
}

void QUARVOAnalyser::lectureSimple(const std::string& genre, const std::string& cle,
                                   Field& result) {
  EvtParamRef e{val(genre), val(cle), ref(result)};
  appelerProcedure("*", vtrf_.text() == "O" ? "GCPCOMPT" : "GCPTCFG", "INTERFACE", "LECTURE_SIMPLE",
                   &e, -1);
}

void QUARVOAnalyser::debut(Evt*) {
  EvtParamVal societe{val("SOCIETE")};
  appelerProcedure("*1", "AFSOCI", "INTERFACE", "LECTURE_CODE", &societe, -1);
  appelerProcedure("*1", "GCPPARAM", "INTERFACE", "LECTURE", nullptr, -1);

  bool liaisonComptable = liaisonC_.text() == "O";
  vtrf_.set("N");
  if (liaisonComptable) {
    appelerProcedure("*1", "CPPARAM", "INTERFACE", "LECTURE", nullptr, -1);
    if (erreurMethode() == 0) vtrf_.set("O");
  }
  if (vtrf_.text() == "N") {
    appelerProcedure("*", "GCPTVA", "INTERFACE", "INIT_TRANSFERT_ASCII", nullptr, -1);
  }

  lectureSimple("J", "ACHAT", vnumjl_);
  // Without an accounting link, purchases go to the file transfer's usual journal.
  if (vnumjl_.text().empty() && !liaisonComptable) vnumjl_.set("60");
  if (vnumjl_.text().empty()) {
    // Nothing can be carried into the accounting: the caller must not take the piece as sound.
    pErreur_.set(int64_t{1});
    erreur("GCPCOMPT", "JL_ACHAT", "Paramètrage de la liaison comptable",
           "Journal des achats non défini !");
    sortir(nullptr, 0);
    return;
  }
  lectureSimple("*", "MACHAT", vmachat_);
}

void QUARVOAnalyser::faire(Evt*) {
  // A silent (batch) analysis writes its error rows in one step; an interactive one never
  // holds the database while a box waits for the user.
  std::optional<Transaction> step;
  if (pMuet_.entier() == 1) step.emplace(session().db());
  pErreur_.set(int64_t{0});
  reprendreNumerotation();
  if (const Kind* kind = kindOf(pcomposant_.text())) {
    appelerProcedure("", "", "", std::string(kind->headerLabel), nullptr, 0);
  }
  if (step) step->commit();
  sortir(nullptr, 0);
}

void QUARVOAnalyser::reprendreNumerotation() {
  immErreur_.effacerCriteres();
  int64_t last = 0;
  if (immErreur_.lire(4) == 0) last = toEntier(erreurIdent_.valeur());
  if (static_cast<double>(last) > pIdent_.dbl()) pIdent_.set(static_cast<double>(last));
  numerotationLue_ = true;
}

void QUARVOAnalyser::analyser_gapecom(Evt*) {
  analyserPiece(kKinds[0]);
}
void QUARVOAnalyser::analyser_gaplcom(Evt*) {
  analyserLignes(kKinds[0]);
}
void QUARVOAnalyser::analyser_gapebl(Evt*) {
  analyserPiece(kKinds[1]);
}
void QUARVOAnalyser::analyser_gaplbl(Evt*) {
  analyserLignes(kKinds[1]);
}
void QUARVOAnalyser::analyser_gapefac(Evt*) {
  analyserPiece(kKinds[2]);
}
void QUARVOAnalyser::analyser_gaplfac(Evt*) {
  analyserLignes(kKinds[2]);
}

void QUARVOAnalyser::analyserPiece(const Kind& kind) {
  vEcomposant_.set(std::string(kind.header));
  vLcomposant_.set(std::string(kind.lines));
  Table& header = this->*kind.headerTable;
  if (header.chercher(3, (this->*kind.headerIdent).name(), '=', pcomposantIdent_.value()) != 0) {
    sortir(nullptr, 0);
    return;
  }
  // The caption names the piece read just above.
  EvtParamRef libel{val(std::string(kind.labelKey)), ref(vLibel_)};
  appelerProcedure("*", "COMMUN", "INTERFACE", "LIRE_LIBEL", &libel, -1);
  EvtParamRef numero{ref(vLibel_), val("$1"), entete("NUMERO_DOC")};
  appelerProcedure("*", "SYSASCII", "INTERFACE", "REMPLACER", &numero, -1);
  vLibPiece_.assign(vLibel_.value());

  appelerProcedure("", "", "", "ANALYSER_ENTETE", nullptr, 0);
  appelerProcedure("", "", "", std::string(kind.lineLabel), nullptr, 0);
  appelerProcedure("", "", "", "ANALYSER_PIED", nullptr, 0);
}

void QUARVOAnalyser::analyserLignes(const Kind& kind) {
  Table& lines = this->*kind.lineTable;
  const Champ& numero = this->*kind.lineNumero;
  const Champ& article = this->*kind.lineArticle;
  const Champ& ht = this->*kind.lineHt;
  std::string prefix = (this->*kind.headerIdent).text() + "|";
  lines.effacerCriteres();
  lines.ajouterCritere(numero.name(), '/', Valeur::chaine(prefix), 'R');
  lines.ouvrir();
  while (lines.lire(1, 'A') == 0) {
    if (article.text().empty() || ht.monnaie().isZero()) continue;
    appelerProcedure("", "", "", "ANALYSER_LIGNE", nullptr, 0);
  }
}

void QUARVOAnalyser::controlerSection() {
  pMessage1_.set("");
  pMessage2_.set("");
  EvtParamRef controle{vEcomposant_.value(),
                       entete("NUMERO_DOC"),
                       entete("DATE_CREATION"),
                       vcsect_.value(),
                       val("1"),
                       pObjet_.value(),
                       ref(pMessage1_),
                       ref(pMessage2_)};
  appelerProcedure("*", "AFAFFA", "INTERFACE", "CONTROLER_SECAN", &controle, -1);
  if (erreurMethode() == 0) return;
  pErreur_.set(int64_t{1});
  erreur(vEcomposant_.text(), entete("NUMERO_DOC").toChaine(), pMessage1_.text(),
         pMessage2_.text());
}

void QUARVOAnalyser::analyser_entete(Evt*) {
  EvtParamVal fournisseur{entete("GCPFOUR_IDENT")};
  appelerProcedure("*1", "GCPFOUR", "INTERFACE", "LECTURE", &fournisseur, -1);
  vcsect_.assign(entete("SECAN_CODE"));
  if (!vcsect_.text().empty()) controlerSection();
}

void QUARVOAnalyser::analyser_ligne(Evt*) {
  vcsect_.assign(entete("SECAN_CODE"));
  if (saisieAnaA_.entier() == 2 && !ligne("SECAN_CODE").toChaine().empty()) {
    vcsect_.assign(ligne("SECAN_CODE"));
    controlerSection();
  }

  // Net amount: the discount first, then the prompt-payment discount on what remains.
  vmt_.set(toMonnaie(ligne("HT")));
  Monnaie remise = Monnaie::fromDouble(toDouble(entete("TAUX_REMISE")));
  vrem_.set(valeurArrondie(vmt_.monnaie() * remise / 100, 2, '='));
  vmt_.set(vmt_.monnaie() - vrem_.monnaie());
  Monnaie escompte = Monnaie::fromDouble(toDouble(entete("TAUX_ESCOMPTE")));
  vesc_.set(valeurArrondie(vmt_.monnaie() * escompte / 100, 2, '='));
  vmt_.set(vmt_.monnaie() - vesc_.monnaie());
  if (vmt_.monnaie().isZero()) return;

  vnumcp_.set("");
  EvtParamRef compte{entete("GCPFOUR_IDENT"), ligne("GCPARTIC_IDENT"), entete("GCPREGM_IDENT"),
                     ligne("GCPTVA_IDENT"),   entete("DATE_CREATION"), ref(vnumcp_)};
  appelerProcedure("", "", "", "COMPTE_ACHAT", &compte, 0);
  if (vnumcp_.text().empty()) {
    pErreur_.set(int64_t{1});
    erreur(
        vEcomposant_.text(), entete("NUMERO_DOC").toChaine(), vLibPiece_.text(),
        "Compte d'achat non défini pour l'article <" + ligne("GCPARTIC_CODE").toChaine() + "> !");
  }
  appelerProcedure("", "", "", "LECTURE_COMPTE", nullptr, 0);
}

void QUARVOAnalyser::analyser_pied(Evt*) {
  struct Frais {
    const char* montant;
    const char* cle;
    const char* message;
  };
  static constexpr Frais kFrais[] = {{"FRAIS_HT", "AFRAIS", "Compte de frais non défini !"},
                                     {"PORT_HT", "APORT", "Compte de port non défini !"}};
  for (const Frais& f : kFrais) {
    vmt_.set(toMonnaie(entete(f.montant)));
    if (vmt_.monnaie().isZero()) continue;
    vnumcp_.set("");
    lectureSimple("C", f.cle, vnumcp_);
    if (vnumcp_.text().empty()) {
      pErreur_.set(int64_t{1});
      erreur(vEcomposant_.text(), entete("NUMERO_DOC").toChaine(), vLibPiece_.text(), f.message);
    }
    appelerProcedure("", "", "", "LECTURE_COMPTE", nullptr, 0);
  }
}

void QUARVOAnalyser::compte_achat(Evt* evt) {
  Field fournisseur("FOURNISSEUR_IDENT", "", "", 4, host::Kind::Chaine, Valeur(), this);
  Field article("ARTICLE_IDENT", "", "", 4, host::Kind::Chaine, Valeur(), this);
  Field regime("REGIME_IDENT", "", "", 4, host::Kind::Chaine, Valeur(), this);
  Field tva("TVA_IDENT", "", "", 4, host::Kind::Chaine, Valeur(), this);
  Field date("PDATE", "", "", 4, host::Kind::Date, Valeur::date(Date()), this);
  Field numcp("PNUMCP", "", "", 4, host::Kind::Chaine, Valeur(), this);
  Field critere("CRITERE_IDENT", "", "", 4, host::Kind::Chaine, Valeur(), this);
  if (evt != nullptr) {
    evt->param(0, fournisseur, 0);
    evt->param(1, article, 0);
    evt->param(2, regime, 0);
    evt->param(3, tva, 0);
    evt->param(4, date, 0);
    evt->param(5, numcp, 1);
  }
  EvtParamRef regroupement{fournisseur.value(), article.value(), ref(critere)};
  appelerProcedure("", "", "", "CRITERE_REGROUPEMENT_A", &regroupement, 0);
  EvtParamRef compte{critere.value(), regime.value(), tva.value(), date.value(), ref(numcp)};
  appelerProcedure("*", "GCPTVA", "INTERFACE", "COMPTE_ACHAT", &compte, -1);
}

void QUARVOAnalyser::critere_regroupement_a(Evt* evt) {
  Field fournisseur("FOURNISSEUR_IDENT", "", "", 4, host::Kind::Chaine, Valeur(), this);
  Field article("ARTICLE_IDENT", "", "", 4, host::Kind::Chaine, Valeur(), this);
  Field critere("CRITERE_IDENT", "", "", 4, host::Kind::Chaine, Valeur(), this);
  if (evt != nullptr) {
    evt->param(0, fournisseur, 0);
    evt->param(1, article, 0);
    evt->param(2, critere, 1);
  }
  int64_t mode = toEntier(vmachat_.value());
  if (mode == 0) {
    EvtParamVal lecture{fournisseur.value()};
    appelerProcedure("*1", "GCPFOUR", "INTERFACE", "LECTURE", &lecture, -1);
    critere.assign(gapffouIdent_.valeur());
    return;
  }
  EvtParamVal lecture{article.value()};
  appelerProcedure("*1", "GCPARTIC", "INTERFACE", "LECTURE", &lecture, -1);
  switch (mode) {
    case 1:
      critere.assign(gcpcrit1Ident_.valeur());
      break;
    case 2:
      critere.assign(gcpcrit2Ident_.valeur());
      break;
    case 3:
      critere.assign(gcpcrit3Ident_.valeur());
      break;
    default:
      critere.set("");
      break;
  }
}

void QUARVOAnalyser::lecture_compte(Evt*) {
  vcpost_.set("");
  EvtParamVal compte{vnumcp_.value()};
  appelerProcedure("*1", "AFCOMP", "INTERFACE", "LECTURE", &compte, -1);
  if (erreurMethode() == 0) vcpost_.assign(cpost_.valeur());
  if (!vcpost_.text().empty()) return;
  pErreur_.set(int64_t{1});
  erreur(vEcomposant_.text(), entete("NUMERO_DOC").toChaine(), vLibPiece_.text(),
         "Poste analytique non défini pour le compte <" + vnumcp_.text() + "> !");
}

void QUARVOAnalyser::erreur(const std::string& compo, const std::string& code,
                            const std::string& desig, const std::string& cmt) {
  pCompo_.set(compo);
  pCode_.set(code);
  pDesig_.set(desig);
  pCmt_.set(cmt);
  appelerProcedure("", "", "", "ECRIRE_ERREUR", nullptr, 0);
}

void QUARVOAnalyser::ecrire_erreur(Evt*) {
  // The number goes on from the last one used, read from the table before the first row (the
  // journal error comes before "FAIRE" reads it); when rows were written meanwhile, it resumes
  // after the table's highest.
  if (!numerotationLue_) reprendreNumerotation();
  int essai = 0;
  for (;;) {
    pIdent_.set(pIdent_.dbl() + 1);
    immErreur_.preparer();
    erreurIdent_.set(identifiant(std::llround(pIdent_.dbl())));
    erreurComposant_.set(pCompo_.text());
    erreurCode_.set(pCode_.text());
    erreurDesig_.set(pDesig_.text());
    erreurCmt_.set(pCmt_.text());
    if (immErreur_.inserer() == 0) break;
    if (++essai == kEssaisNumero) {
      throw UException("no free number for an error row after " + erreurIdent_.text());
    }
    reprendreNumerotation();
  }
  if (pMuet_.entier() != 1) {
    BoiteDialogue("Attention", pDesig_.text() + "@" + pCmt_.text(), 8, {"$1~OK"});
  }
}

}  // namespace quarvo
