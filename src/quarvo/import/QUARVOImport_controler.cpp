#include "quarvo/import/QUARVOImport_controler.h"

#include <algorithm>
#include <set>

#include "host/Texte.h"
#include "host/session/Session.h"
#include "host/value/Identifiant.h"
#include "quarvo/import/ImportOutils.h"

namespace quarvo {

using namespace host;
using host::identifiant;
using import::enNombre;

QUARVOImport_controler::QUARVOImport_controler(Evt* evt, const DifferencesControle& kind)
    : Parcours(evt),
      kind_(kind),
      pErreur_(entier("P_ERREUR")),
      vDateDeb_(date("V_DATE_DEB")),
      vDateFin_(date("V_DATE_FIN")),
      vIdent_(dbl("V_IDENT")),
      vCritereAchat_(chaine("V_CRITERE_ACHAT")),
      vPrestationIdent_(chaine("V_PRESTATION_IDENT")),
      vJauge1_(dbl("V_JAUGE1")),
      vJauge2_(dbl("V_JAUGE2")),
      vCmt_(chaine("V_CMT")),
      pMessage1_(chaine("P_MESSAGE1")),
      pMessage2_(chaine("P_MESSAGE2")),
      erreurs_(this, "VOVOVA", "IMM_ERREUR", "ERREURS"),
      gcptxtva_(this, "GESCOM", "GCPTXTVA", "GCPTXTVA2"),
      iAfpara_(this, "VOVOVA", "I_AFPARA", ""),
      iAfsoci_(this, "VOVOVA", "I_AFSOCI", ""),
      iGcpartic_(this, "GESCOM", "I_GCPARTIC", ""),
      iGcpfour_(this, "GESCOM", "I_GCPFOUR", "") {
  if (kind_.budget) afebud_ = std::make_unique<Table>(this, "VOVOVA", "AFEBUD", "");
  if (kind_.avoirs) {
    staging2_ =
        std::make_unique<Table>(this, "VOVOVA", kind_.staging, std::string(kind_.staging) + "2");
  }
  lierParametres(evt, {{&pErreur_, 1}});
  nomBase("VOVOVA");
  nomTable(kind_.staging);
  addBranch("DEBUT", [this](Evt* e) { debut(e); });
  addBranch("POUR_TOUT", [this](Evt* e) { pour_tout(e); });
  addBranch("ECRIRE_ERREUR", [this](Evt* e) { ecrire_erreur(e); });
  addBranch("SORTIE", [this](Evt* e) { sortie(e); });
  addBranch("SUPPRIMER_ERREURS", [this](Evt* e) { supprimer_erreurs(e); });
}

QUARVOImport_controler::~QUARVOImport_controler() = default;

std::string QUARVOImport_controler::staged(const char* column) {
  return courant().valeur(column).toChaine();
}

void QUARVOImport_controler::debut(Evt* evt) {
  Automate::debut(evt);
  transaction_ = std::make_unique<Transaction>(session().db());

  EvtParamVal societe{val("SOCIETE")};
  appelerProcedure("*1", "AFSOCI", "INTERFACE", "LECTURE_CODE", &societe, -1);
  EvtParamVal machat{val("MACHAT")};
  appelerProcedure("*1", "AFPARA", "INTERFACE", "LECTURE_CODE", &machat, -1);
  bool parametreLu = erreurMethode() == 0;
  vCritereAchat_.set("0");
  if (parametreLu && toEntier(iAfpara_.valeur("PARAM3")) == 1) {
    vCritereAchat_.assign(iAfpara_.valeur("PARAM1"));
  }

  auto debuts = splitList(iAfsoci_.valeur("DATE_DEBUT").toChaine());
  if (debuts.size() > 1) {
    if (auto d = Date::parse(debuts[1])) vDateDeb_.set(*d);
  }
  vDateFin_.set(import::finDuMois(iAfsoci_.valeur("MOIS_ANNEE").toChaine()));

  pErreur_.set(int64_t{0});
  erreurs_.effacerCriteres();
  int64_t last = 0;
  if (erreurs_.lire(4, 'A') == 0) last = enNombre(erreurs_.valeur("IDENT").toChaine());
  vIdent_.set(static_cast<double>(last));
  premiereErreur_ = identifiant(last + 1);

  Table compte(this, "VOVOVA", kind_.staging, "COMPTE");
  compte.effacerCriteres();
  int64_t total = compte.compter();
  vJauge1_.set(0.0);
  vJauge2_.set(static_cast<double>(total));
  pasJauge_ = std::max<int64_t>(1, total / 100);
  EvtParamVal titre{val(std::string("Traitement de la table ") + kind_.staging)};
  appelerProcedure("*", "COMMUN", "INTERFACE", "BOITE_AFFICHER_TITRE", &titre, -1);
  EvtParamVal libelle{val("Etape 2 : contrôle avant import ...")};
  appelerProcedure("*", "COMMUN", "INTERFACE", "BOITE_AFFICHER_LIBELLE", &libelle, -1);
}

void QUARVOImport_controler::erreur(const std::string& message) {
  vCmt_.set(message);
  ligneEnErreur_ = true;
  EvtParamVal none;
  appelerProcedure("", "", "", "ECRIRE_ERREUR", &none, 0);
}

void QUARVOImport_controler::pour_tout(Evt*) {
  pieceCourante_ = staged("NUMERO_DOC");
  ligneEnErreur_ = false;
  Table& row = courant();

  // 1-2. Piece number and date.
  if (pieceCourante_.empty()) erreur("No de pièce non renseigné");
  Date datePiece = toDate(row.valeur("DATE_CREATION"));
  if (datePiece.empty()) {
    erreur("Date de pièce non renseignée");
  } else if (datePiece > vDateFin_.date()) {
    erreur("Date de pièce supérieure au mois en cours");
  }

  // 3. Supplier.
  std::string fournisseur = staged("FOURNISSEUR");
  EvtParamVal four{val(fournisseur)};
  appelerProcedure("*1", "GCPFOUR", "INTERFACE", "LECTURE_CODE", &four, -1);
  if (erreurMethode() != 0) erreur("Code fournisseur <" + fournisseur + "> inexistant");
  std::string regime = iGcpfour_.valeur("GCPREGM_IDENT").toChaine();

  // 4. Project section.
  pMessage1_.set("");
  pMessage2_.set("");
  EvtParamRef secan{val(kind_.staging),
                    val(pieceCourante_),
                    Arg(row.valeur("DATE_CREATION")),
                    val(staged("AFFAIRE")),
                    val("1"),
                    val(""),
                    ref(pMessage1_),
                    ref(pMessage2_)};
  appelerProcedure("*", "AFAFFA", "INTERFACE", "CONTROLER_SECAN", &secan, -1);
  if (erreurMethode() != 0) erreur(pMessage2_.text());

  // 5. Budget within the project.
  std::string budget = staged("BUDGET");
  if (afebud_ && !budget.empty()) {
    if (afebud_->chercher(3, "CLE_COMPO2", '=', Valeur::chaine(staged("AFFAIRE") + "|" + budget)) !=
        0) {
      erreur("Code budget <" + budget + "> inexistant");
    }
  }

  // 6. Article, its service, the VAT rate of the supplier's regime.
  std::string article = staged("ARTICLE");
  if (!article.empty()) {
    EvtParamVal art{val(article)};
    appelerProcedure("*1", "GCPARTIC", "INTERFACE", "LECTURE_CODE", &art, -1);
    if (erreurMethode() != 0) {
      erreur("Code article <" + article + "> inexistant");
    } else {
      vPrestationIdent_.set("");
      EvtParamRef regroupement{Arg(vCritereAchat_.value()),
                               Arg(iGcpartic_.valeur("IDENT")),
                               Arg(iGcpartic_.valeur("GCPCRIT1_IDENT")),
                               Arg(iGcpartic_.valeur("GCPCRIT2_IDENT")),
                               Arg(iGcpartic_.valeur("GCPCRIT3_IDENT")),
                               ref(vPrestationIdent_)};
      appelerProcedure("*", "AFPARA", "INTERFACE", "REGROUPEMENT_ACHAT", &regroupement, -1);
      EvtParamVal pres{Arg(vPrestationIdent_.value())};
      appelerProcedure("*1", "AFPRES", "INTERFACE", "LECTURE", &pres, -1);
      if (erreurMethode() != 0)
        erreur("Code article <" + article + "> : lien prestation inexistant");
    }
    Valeur taux = row.valeur("TAUX_TVA");
    gcptxtva_.effacerCriteres();
    gcptxtva_.ajouterCritere("GCPREGM_IDENT", '=', Valeur::chaine(regime), 'R');
    gcptxtva_.ouvrir();
    bool trouve = false;
    while (!trouve && gcptxtva_.lire(1, 'A') == 0) {
      trouve = Valeur::compare(gcptxtva_.valeur("TAUX"), taux) == 0;
    }
    if (!trouve) erreur("Taux de TVA <" + taux.toChaine() + "> inexistant");
  }

  // The line's amount must be one: QTE × PUHT within the range of amounts. Such a line could
  // not be generated; its piece is refused here, naming where, and the others go on.
  try {
    (void)(toMonnaie(row.valeur("PUHT")) * Monnaie::fromDouble(toDouble(row.valeur("QTE"))));
  } catch (const std::exception&) {
    erreur("Ligne " + staged("LIGNE_FICHIER") + ", colonne PUHT, valeur " + staged("PUHT") +
           " : montant de la ligne (QTE × PUHT) hors limites");
  }

  // 7. Invoices: a line that is not valid also stages its credit-note line. A faulty line
  // stages nothing: its piece is refused as a whole.
  if (staging2_ && !ligneEnErreur_ && toEntier(row.valeur("VALIDE")) != 1 &&
      staged("TYPE") == "F") {
    const Row source = row.ligne();
    staging2_->preparer();
    const auto& columns = staging2_->store().schema().columns();
    for (size_t i = 0; i < columns.size() && i < source.values.size(); ++i) {
      if (columns[i].name != "IDENT") staging2_->ecrire(columns[i].name, source.values[i]);
    }
    staging2_->ecrire("NUMERO_DOC",
                      Valeur::chaine("A" + derniersCaracteres(pieceCourante_, 9)));
    staging2_->ecrire("TYPE", Valeur::chaine("A"));
    if (staging2_->inserer() == 0) avoirs_.emplace_back(pieceCourante_, staging2_->courantId());
  }

  // 8. Gauge.
  vJauge1_.set(vJauge1_.dbl() + 1);
  jauge();
}

void QUARVOImport_controler::jauge() {
  auto done = static_cast<int64_t>(vJauge1_.dbl());
  auto total = static_cast<int64_t>(vJauge2_.dbl());
  if (done % pasJauge_ != 0 && done != total) return;
  EvtParamVal gauge{Arg(vJauge1_.value()), Arg(vJauge2_.value())};
  appelerProcedure("*", "COMMUN", "INTERFACE", "BOITE_AFFICHER_JAUGE", &gauge, -1);
}

void QUARVOImport_controler::ecrire_erreur(Evt* evt) {
  vIdent_.set(vIdent_.dbl() + 1);
  erreurs_.preparer();
  erreurs_.ecrire("IDENT", Valeur::chaine(identifiant(static_cast<int64_t>(vIdent_.dbl()))));
  erreurs_.ecrire("COMPOSANT", Valeur::chaine(kind_.staging));
  erreurs_.ecrire("CODE", Valeur::chaine(pieceCourante_));
  erreurs_.ecrire("DESIG", Valeur::chaine(kind_.prefixe + pieceCourante_));
  erreurs_.ecrire("CMT", vCmt_.value());
  erreurs_.inserer();
  pErreur_.set(int64_t{1});
  erreurMethode(0, evt);
}

void QUARVOImport_controler::sortie(Evt* evt) {
  sortieFaite();
  EvtParamVal none;
  appelerProcedure("", "", "", "SUPPRIMER_ERREURS", &none, 0);
  appelerProcedure("*", "COMMUN", "INTERFACE", "BOITE_SORTIR", &none, -1);
  if (transaction_) {
    transaction_->commit();
    transaction_.reset();
  }
  Automate::sortie(evt);
}

void QUARVOImport_controler::supprimer_erreurs(Evt* evt) {
  // Only the errors of this run: errors left by an earlier run (the error table is kept for
  // the report) must not remove the rows of a file that has since been corrected.
  Table lues(this, "VOVOVA", "IMM_ERREUR", "ERREURS_LUES");
  lues.effacerCriteres();
  lues.ajouterCritere("COMPOSANT", '=', Valeur::chaine(kind_.staging));
  lues.ajouterCritere("IDENT", '+', Valeur::chaine(premiereErreur_));
  lues.ouvrir();
  std::set<std::string> refusees;
  Table staging(this, "VOVOVA", kind_.staging, "SUPPRESSION");
  while (lues.lire(1, 'A') == 0) {
    std::string code = lues.valeur("CODE").toChaine();
    if (!refusees.insert(code).second) continue;
    staging.effacerCriteres();
    staging.ajouterCritere("NUMERO_DOC", '=', Valeur::chaine(code));
    staging.supprimerTout();
  }
  // Credit-note lines staged from an invoice that was refused go with it.
  for (const auto& [source, id] : avoirs_) {
    if (refusees.count(source) == 0) continue;
    if (staging.aller(id) == 0) staging.supprimer('N');
  }
  erreurMethode(0, evt);
}

}  // namespace quarvo
