#include "quarvo/import/QUARVOImport_generer.h"

#include <algorithm>

#include "host/Texte.h"
#include "host/session/Session.h"
#include "quarvo/frame/Appels.h"
#include "quarvo/frame/Apports.h"
#include "quarvo/frame/Keys.h"
#include "quarvo/frame/PieceKinds.h"
#include "quarvo/import/ImportOutils.h"

namespace quarvo {

using namespace host;
using Solde = DifferencesGeneration::Solde;

QUARVOImport_generer::QUARVOImport_generer(Evt* evt, const DifferencesGeneration& kind)
    : Parcours(evt),
      kind_(kind),
      pErreur_(entier("P_ERREUR")),
      vMo_(chaine("V_MO")),
      vAn_(chaine("V_AN")),
      vAnmo_(chaine("V_ANMO")),
      vCodePartage_(chaine("V_CODE_PARTAGE")),
      vDepotIdent_(chaine("V_DEPOT_IDENT")),
      vCreerPiece_(chaine("V_CREER_PIECE")),
      vPieceIdent_(chaine("V_PIECE_IDENT")),
      vAvoir_(entier("V_AVOIR")),
      vCreerAflbud_(entier("V_CREER_AFLBUD")),
      vQte_(dbl("V_QTE")),
      vHt_(monnaie("V_HT")),
      vChoix_(chaine("V_CHOIX")),
      vCritereAchat_(chaine("V_CRITERE_ACHAT")),
      vPrestationIdent_(chaine("V_PRESTATION_IDENT")),
      pAffa_(chaine("PAFFA")),
      pPost_(chaine("PPOST")),
      pAnmo_(chaine("PANMO")),
      vJauge1_(dbl("V_JAUGE1")),
      vJauge2_(dbl("V_JAUGE2")),
      vTexte_(chaine("VTEXTE")),
      pieces_(this, "GESCOM", kind.entete, "PIECES"),
      genere_(this, "", "M_GENERE", "M_GENERE2"),
      gcptxtva_(this, "GESCOM", "GCPTXTVA", "GCPTXTVA2"),
      afebud_(this, "VOVOVA", "AFEBUD", ""),
      aflbud_(this, "VOVOVA", "AFLBUD", ""),
      quarvo_(this, "VOVOVA", "QUARVO", ""),
      iAfsoci_(this, "VOVOVA", "I_AFSOCI", ""),
      iAfpara_(this, "VOVOVA", "I_AFPARA", ""),
      iGcpste_(this, "GESCOM", "I_GCPSTE", ""),
      iGcpfour_(this, "GESCOM", "I_GCPFOUR", ""),
      iGcpartic_(this, "GESCOM", "I_GCPARTIC", ""),
      iAfaffa_(this, "VOVOVA", "I_AFAFFA", ""),
      iAfpres_(this, "VOVOVA", "I_AFPRES", "") {
  lierParametres(evt, {{&pErreur_, 1}});
  nomBase("VOVOVA");
  nomTable(kind_.staging);
  plan({"NUMERO_DOC"}, "NUMERO_DOC");
  addBranch("DEBUT", [this](Evt* e) { debut(e); });
  addBranch("DEBUT1", [this](Evt* e) { debut1(e); });
  addBranch("POUR_TOUT", [this](Evt* e) { pour_tout(e); });
  if (kind_.majLigne) addBranch("MAJ_LIGNE", [this](Evt* e) { maj_ligne(e); });
  addBranch("FIN1", [this](Evt* e) { fin1(e); });
  addBranch("SORTIE", [this](Evt* e) { sortie(e); });
  addBranch("MESSAGE_ERREUR", [this](Evt* e) { message_erreur(e); });
}

QUARVOImport_generer::~QUARVOImport_generer() = default;

Valeur QUARVOImport_generer::stagedValeur(const char* column) {
  auto i = courant().store().schema().index(column);
  if (!i || *i >= ligne_.values.size()) return Valeur();
  return ligne_.values[*i];
}

std::string QUARVOImport_generer::staged(const char* column) {
  return stagedValeur(column).toChaine();
}

bool QUARVOImport_generer::appeler(const char* module, const char* label, Evt& evt,
                                   const char* instance) {
  appelerProcedure(instance, module, "INTERFACE", label, &evt, -1);
  return erreurMethode() == 0;
}

bool QUARVOImport_generer::protocole(const char* label, Evt& evt) {
  if (appeler(kind_.entete, label, evt)) return true;
  EvtParamVal none;
  appelerProcedure("", "", "", "MESSAGE_ERREUR", &none, 0);
  return false;
}

void QUARVOImport_generer::jauge() {
  vJauge1_.set(vJauge1_.dbl() + 1);
  auto done = static_cast<int64_t>(vJauge1_.dbl());
  auto total = static_cast<int64_t>(vJauge2_.dbl());
  if (done % pasJauge_ != 0 && done != total) return;
  EvtParamVal gauge{Arg(vJauge1_.value()), Arg(vJauge2_.value())};
  appelerProcedure("*", "COMMUN", "INTERFACE", "BOITE_AFFICHER_JAUGE", &gauge, -1);
}

// ---------------------------------------------------------------------------------------------

void QUARVOImport_generer::debut(Evt* evt) {
  Automate::debut(evt);
  Table compte(this, "VOVOVA", kind_.staging, "COMPTE");
  compte.effacerCriteres();
  int64_t total = compte.compter();
  if (total == 0) {
    sortir(nullptr, 0);
    return;
  }
  if (kind_.moisSociete) {
    EvtParamVal societe{val("SOCIETE")};
    appeler("AFSOCI", "LECTURE_CODE", societe, "*1");
    std::string moisAnnee = iAfsoci_.valeur("MOIS_ANNEE").toChaine();
    vMo_.set(caracteres(moisAnnee, 1, 2));
    vAn_.set(caracteres(moisAnnee, 3, 6));
    vAnmo_.set(vAn_.text() + vMo_.text());
    receptions_ = iAfsoci_.valeur("OPTION9").toChaine() == "O";
  }
  EvtParamVal machat{val("MACHAT")};
  bool parametreLu = appeler("AFPARA", "LECTURE_CODE", machat, "*1");
  vCritereAchat_.set("0");
  if (parametreLu && toEntier(iAfpara_.valeur("PARAM3")) == 1) {
    vCritereAchat_.assign(iAfpara_.valeur("PARAM1"));
  }

  lot_ = std::make_unique<TransactionsGroupees>(session().db());
  EvtParamRef generation{ref(vCodePartage_), val("U")};
  generationOuverte_ = protocole("DEBUT_GENERATION", generation);

  if (genere_.chercher(3, "INST", '=', vCodePartage_.value()) != 0) {
    EvtParamRef message{val("115"), ref(vChoix_), val(kind_.entete)};
    appelerProcedure("*", "COMMUN", "INTERFACE", "MESS_OK", &message, -1);
    pErreur_.set(int64_t{1});
    sortir(nullptr, 0);
    return;
  }

  EvtParamVal settings{val("")};
  appeler("GCPSTE", "LECTURE", settings);
  saisieAna_ = toEntier(iGcpste_.valeur("SAISIE_ANA_A"));
  EvtParamRef depot{ref(vDepotIdent_)};
  appeler("GCPSTE", "DEPOT", depot);
  if (vDepotIdent_.text().empty()) {
    EvtParamRef principal{ref(vDepotIdent_)};
    appeler("GCPDEPOT", "DEPOT_PRINCIPAL", principal);
  }

  vJauge1_.set(0.0);
  vJauge2_.set(static_cast<double>(total));
  pasJauge_ = std::max<int64_t>(1, total / 100);
  EvtParamVal titre{val(std::string("Traitement de la table ") + kind_.staging)};
  appelerProcedure("*", "COMMUN", "INTERFACE", "BOITE_AFFICHER_TITRE", &titre, -1);
  boiteOuverte_ = true;
  EvtParamVal libelle{val("Etape 3 : import ...")};
  appelerProcedure("*", "COMMUN", "INTERFACE", "BOITE_AFFICHER_LIBELLE", &libelle, -1);
}

void QUARVOImport_generer::abandonnerPiece() {
  piece_.reset();  // rolls back everything written for the piece
  liens_.clear();
  vCreerPiece_.set("0");
  vPieceIdent_.set("");
}

void QUARVOImport_generer::debut1(Evt*) {
  ligne_ = courant().ligne();
  piece_.reset();
  if (lot_) lot_->uniteTerminee();  // the previous piece has ended
  vCreerPiece_.set("1");
  vPieceIdent_.set("");
  liens_.clear();
  rang_ = 0;
  std::string numero = staged("NUMERO_DOC");
  if (pieces_.chercher(3, "NUMERO_DOC", '=', Valeur::chaine(numero)) == 0) {
    // Generated before (by an earlier run): kept as it is, only settled when asked.
    vCreerPiece_.set("0");
    vPieceIdent_.assign(pieces_.valeur("IDENT"));
    return;
  }
  vAvoir_.set(int64_t{kind_.avoirs && staged("TYPE") == "A" ? 1 : 0});

  EvtParamVal four{val(staged("FOURNISSEUR"))};
  appeler("GCPFOUR", "LECTURE_CODE", four, "*1");
  fournisseurIdent_ = iGcpfour_.valeur("IDENT").toChaine();
  regime_ = iGcpfour_.valeur("GCPREGM_IDENT").toChaine();

  piece_ = std::make_unique<Transaction>(session().db());
  std::vector<Arg> args{ref(vPieceIdent_), val(fournisseurIdent_),
                        Arg(stagedValeur("DATE_CREATION")), ref(vDepotIdent_), val("EUR")};
  if (kind_.avoirs) {
    args.push_back(val(-1));
    args.push_back(val(saisieAna_ == 1 ? staged("AFFAIRE") : std::string()));
    args.push_back(ref(vAvoir_));
  } else if (saisieAna_ == 1) {
    args.push_back(val(-1));
    args.push_back(val(staged("AFFAIRE")));
  }
  EvtParamRef debutPiece(std::move(args));
  if (!protocole("DEBUT_PIECE_GENEREE", debutPiece)) {
    abandonnerPiece();
    return;
  }
}

void QUARVOImport_generer::pour_tout(Evt*) {
  ligne_ = courant().ligne();
  if (vCreerPiece_.text() != "1") {
    jauge();
    return;
  }
  // An empty exchange record for the line.
  if (genere_.chercher(3, "INST", '=', vCodePartage_.value()) != 0) {
    abandonnerPiece();
    jauge();
    return;
  }
  const auto& colonnes = genere_.store().schema().columns();
  for (const auto& c : colonnes) {
    if (c.name != "INST") genere_.ecrire(c.name, Valeur::chaine(""));
  }

  // A comment line has no service: it is never booked on a budget.
  vPrestationIdent_.set("");
  std::string article = staged("ARTICLE");
  if (!article.empty()) {
    EvtParamVal art{val(article)};
    appeler("GCPARTIC", "LECTURE_CODE", art, "*1");
    EvtParamRef regroupement{Arg(vCritereAchat_.value()),
                             Arg(iGcpartic_.valeur("IDENT")),
                             Arg(iGcpartic_.valeur("GCPCRIT1_IDENT")),
                             Arg(iGcpartic_.valeur("GCPCRIT2_IDENT")),
                             Arg(iGcpartic_.valeur("GCPCRIT3_IDENT")),
                             ref(vPrestationIdent_)};
    appeler("AFPARA", "REGROUPEMENT_ACHAT", regroupement);
    EvtParamVal lien{Arg(iGcpartic_.valeur("IDENT")), val(fournisseurIdent_), val(1)};
    appeler("GAPARTFO", "LECTURE_ET_CREATION", lien);

    genere_.ecrire("GCPARTIC_IDENT", iGcpartic_.valeur("IDENT"));
    genere_.ecrire("GCPARTIC_CODE", iGcpartic_.valeur("CODE"));
    std::string desig = staged("DESIG");
    genere_.ecrire("DESIG", desig.empty() ? iGcpartic_.valeur("DESIG") : Valeur::chaine(desig));
    genere_.ecrire("QTE", stagedValeur("QTE"));
    genere_.ecrire("PUHT", stagedValeur("PUHT"));
    genere_.ecrire("TAUX_REMISE", stagedValeur("TAUX_REMISE"));
    genere_.ecrire("GCPDEPOT_IDENT", vDepotIdent_.value());
    if (saisieAna_ == 2) genere_.ecrire("SECAN_CODE", stagedValeur("AFFAIRE"));
    gcptxtva_.effacerCriteres();
    gcptxtva_.ajouterCritere("GCPREGM_IDENT", '=', Valeur::chaine(regime_), 'A');
    gcptxtva_.ouvrir();
    Valeur taux = stagedValeur("TAUX_TVA");
    while (gcptxtva_.lire(1, 'A') == 0) {
      if (Valeur::compare(gcptxtva_.valeur("TAUX"), taux) == 0) {
        genere_.ecrire("GCPTVA_IDENT", gcptxtva_.valeur("GCPTVA_IDENT"));
        break;
      }
    }
  } else {
    genere_.ecrire("DESIG", stagedValeur("DESIG"));
    genere_.ecrire("STYLE", Valeur::entier(2));
  }

  genere_.modifier();
  EvtParamVal none;
  if (!protocole("LIGNE_COPIEE", none)) {
    abandonnerPiece();
    jauge();
    return;
  }
  ++rang_;
  if (kind_.majLigne) appelerProcedure("", "", "", "MAJ_LIGNE", &none, 0);
  jauge();
}

void QUARVOImport_generer::maj_ligne(Evt*) {
  std::string budget = staged("BUDGET");
  if (budget.empty()) return;
  std::string affaire = staged("AFFAIRE");
  EvtParamVal projet{val(affaire)};
  if (!appeler("AFAFFA", "LECTURE_CODE", projet, "*1")) return;
  // The service comes by its identifier (read by code it would never be found).
  EvtParamVal service{Arg(vPrestationIdent_.value())};
  if (vPrestationIdent_.text().empty() || !appeler("AFPRES", "LECTURE", service, "*1")) return;
  if (afebud_.chercher(3, "CLE_COMPO2", '=', Valeur::chaine(affaire + "|" + budget)) != 0) return;

  // The line is booked with its piece, once the piece is complete and settled: its net amount
  // and what settling leaves of it are known only then. Lines of one service in one budget
  // share one budget line and one link row.
  std::string budgetIdent = afebud_.valeur("IDENT").toChaine();
  std::string numero = frame::numeroLigne(vPieceIdent_.text(), std::to_string(rang_));
  for (auto& lien : liens_) {
    if (lien.budget == budgetIdent && lien.service == vPrestationIdent_.text()) {
      lien.lignes.push_back(numero);
      return;
    }
  }
  LienAReporter lien;
  lien.budget = budgetIdent;
  lien.service = vPrestationIdent_.text();
  lien.budgetAffaire = afebud_.valeur("AFAFFA_IDENT");
  lien.budgetAffaireCode = afebud_.valeur("AFAFFA_CODE");
  lien.budgetPiece = afebud_.valeur("PIECE");
  lien.budgetDebut = afebud_.valeur("DATE_DEBUT");
  lien.budgetFin = afebud_.valeur("DATE_FIN");
  lien.affaire = iAfaffa_.valeur("IDENT");
  lien.affaireCode = iAfaffa_.valeur("CODE");
  lien.serviceCode = iAfpres_.valeur("CODE");
  lien.serviceDesig = iAfpres_.valeur("DESIG");
  lien.serviceUnite = iAfpres_.valeur("UNITE");
  lien.servicePoste = iAfpres_.valeur("POSTE_ACHAT");
  lien.lignes.push_back(numero);
  liens_.push_back(std::move(lien));
}

void QUARVOImport_generer::reporterSurBudgets() {
  if (liens_.empty()) return;
  if (pieces_.chercher(3, "IDENT", '=', vPieceIdent_.value()) != 0) return;
  auto colonneEntete = [this](const std::string& c) { return pieces_.valeur(c); };
  frame::EnteteAchat entete = frame::enteteAchat(kind_.entete, colonneEntete);
  Valeur dateMaj = pieces_.valeur("DATE_MAJ");
  Valeur heureMaj = pieces_.valeur("HEURE_MAJ");
  Table lignes(this, "GESCOM", std::string(frame::kindOfTable(kind_.entete)->lines),
               "LIGNES_PIECE");
  auto colonneLigne = [&lignes](const std::string& c) { return lignes.valeur(c); };
  for (const auto& lien : liens_) {
    double qte = 0;
    double qtt = 0;
    Monnaie ht;
    bool lie = false;
    for (const auto& numero : lien.lignes) {
      if (lignes.chercher(3, "NUMERO", '=', Valeur::chaine(numero)) != 0) continue;
      frame::ApportLigne apport = frame::apportLigne(entete, frame::ligneAchat(colonneLigne));
      if (apport.qte == 0) continue;  // nothing left of the line: linked to nothing
      qte += apport.qte;
      qtt += apport.qtt;
      ht += apport.ht;
      lie = true;
    }
    if (!lie) continue;
    vQte_.set(qte);
    vHt_.set(ht);
    reporterLien(lien, qtt, dateMaj, heureMaj);
  }
}

void QUARVOImport_generer::reporterLien(const LienAReporter& lien, double qtt,
                                        const Valeur& dateMaj, const Valeur& heureMaj) {
  aflbud_.effacerCriteres();
  aflbud_.ajouterCritere("NUMERO", '/', Valeur::chaine(lien.budget + "|"), 'R');
  aflbud_.ouvrir();
  vCreerAflbud_.set(int64_t{1});
  while (aflbud_.lire(1, 'A') == 0) {
    if (aflbud_.valeur("AFPRES_IDENT").toChaine() == lien.service) {
      vCreerAflbud_.set(int64_t{0});
      break;
    }
  }
  if (vCreerAflbud_.entier() == 1) {
    Field& ident = chaine("V_AFLBUD_IDENT");
    if (!frame::numeroter(*this, "VOVOVA", "AFLBUD", ident)) return;
    aflbud_.preparer();
    aflbud_.ecrire("IDENT", ident.value());
    aflbud_.ecrire("NUMERO", Valeur::chaine(lien.budget + "|"));
    aflbud_.ecrire("AFAFFA_IDENT", lien.budgetAffaire);
    aflbud_.ecrire("AFAFFA_CODE", lien.budgetAffaireCode);
    aflbud_.ecrire("AFEBUD_PIECE", lien.budgetPiece);
    aflbud_.ecrire("AFPRES_IDENT", Valeur::chaine(lien.service));
    aflbud_.ecrire("AFPRES_CODE", lien.serviceCode);
    aflbud_.ecrire("DESIG", lien.serviceDesig);
    aflbud_.ecrire("UNITE", lien.serviceUnite);
    aflbud_.ecrire("DATE_DEBUT", lien.budgetDebut);
    aflbud_.ecrire("DATE_FIN", lien.budgetFin);
    aflbud_.ecrire("APPRO", Valeur::chaine("A"));
    if (aflbud_.inserer() != 0) return;
  }
  std::string ligneIdent = aflbud_.valeur("IDENT").toChaine();

  std::string cle = frame::cleCompo(ligneIdent, kind_.entete, staged("NUMERO_DOC"));
  frame::ApportLien avant;
  if (quarvo_.chercher(3, "CLE_COMPO", '=', Valeur::chaine(cle)) == 0) {
    avant = frame::apportLien(quarvo_, receptions_);
  } else {
    Field& ident = chaine("V_QUARVO_IDENT");
    if (!frame::numeroter(*this, "VOVOVA", "QUARVO", ident)) return;
    quarvo_.preparer();
    quarvo_.ecrire("IDENT", ident.value());
    quarvo_.ecrire("AFEBUD_IDENT", Valeur::chaine(lien.budget));
    quarvo_.ecrire("AFAFFA_IDENT", lien.affaire);
    quarvo_.ecrire("AFAFFA_CODE", lien.affaireCode);
    quarvo_.ecrire("AFLBUD_IDENT", Valeur::chaine(ligneIdent));
    quarvo_.ecrire("COMPOSANT", Valeur::chaine(kind_.entete));
    quarvo_.ecrire("COMPOSANT_IDENT", vPieceIdent_.value());
    quarvo_.ecrire("PIECE", stagedValeur("NUMERO_DOC"));
    quarvo_.ecrire("DATE_PIECE", stagedValeur("DATE_CREATION"));
    quarvo_.ecrire("DATE_MAJ", dateMaj);
    quarvo_.ecrire("HEURE_MAJ", heureMaj);
    quarvo_.ecrire("CLE_COMPO", Valeur::chaine(cle));
    quarvo_.ecrire("CLE_COMPO2",
                   Valeur::chaine(frame::cleCompo2(kind_.entete, vPieceIdent_.text())));
    quarvo_.inserer();
  }
  quarvo_.ecrire("QTE", Valeur::dbl(toDouble(quarvo_.valeur("QTE")) + vQte_.dbl()));
  quarvo_.ecrire("HT", Valeur::monnaie(toMonnaie(quarvo_.valeur("HT")) + vHt_.monnaie()));
  quarvo_.ecrire("QTT", Valeur::dbl(toDouble(quarvo_.valeur("QTT")) + qtt));
  quarvo_.modifier();
  frame::ApportLien apres = frame::apportLien(quarvo_, receptions_);

  // The budget line takes what the link row now books, less what it booked before.
  Champ veng("VENG", aflbud_);
  Champ vrea("VREA", aflbud_);
  Monnaie engage = apres.engage - avant.engage;
  Monnaie realise = apres.realise - avant.realise;
  veng.set(veng.monnaie() + engage);
  for (size_t i = 0; i < 3; ++i) vrea.setAt(i, vrea.at(i) + realise);
  frame::restesEtAvancement(aflbud_);
  aflbud_.modifier();

  if (kind_.resultats) {
    std::string datePiece = quarvo_.valeur("DATE_PIECE").toChaine();
    vAn_.set(caracteres(datePiece, 7, 10));
    vMo_.set(caracteres(datePiece, 4, 5));
    vAnmo_.set(vAn_.text() + vMo_.text());
    Table resu(this, "", "M_RESU1", "");
    resu.preparer();
    resu.ecrire("AFAFFA_IDENT", lien.affaire);
    resu.ecrire("AFPOST_CODE", lien.servicePoste);
    resu.ecrire("ANNEE_MOIS", vAnmo_.value());
    resu.ecrire("TYPE", Valeur::chaine("D"));
    resu.ecrire("VENG", Valeur::monnaie(-engage));
    resu.inserer();
    EvtParamVal none;
    appeler("AFRESU", "MAJ_AFRESU", none);
  }
  if (kind_.calculRaf) {
    pAffa_.assign(lien.affaire);
    pPost_.assign(lien.servicePoste);
    pAnmo_.assign(vAnmo_.value());
    EvtParamRef raf{ref(pAffa_), ref(pPost_), ref(pAnmo_)};
    appeler("AFRESU", "CALCUL_RAF_D", raf);
  }
  // A receipt that books on the realised amounts has its accounting movement, as when it is
  // linked by hand or by the imputation (invoices get theirs with the piece).
  if (kind_.mouvementLien && !realise.isZero()) {
    EvtParamVal lecture{val(kind_.entete), vPieceIdent_.value()};
    if (!appeler("AFMOUV", "LECTURE_CLE_COMPO", lecture)) {
      EvtParamVal genere{val(kind_.entete), vPieceIdent_.value()};
      appeler("AFMOUV", "GENERER_PIECE", genere);
      EvtParamVal maj{val(kind_.entete), vPieceIdent_.value()};
      appeler("AFMOUV", "MAJ_PIECE_GENEREE", maj);
    }
  }
}

// ---------------------------------------------------------------------------------------------

std::string QUARVOImport_generer::demandeur(const std::string& code) {
  if (code.empty()) return "";
  EvtParamVal personne{val(code)};
  if (!appeler("AFPERS", "LECTURE_CODE", personne, "*1")) return "";
  Table iAfpers(this, "VOVOVA", "I_AFPERS", "");
  Valeur nom = iAfpers.valeur("NOM");
  Valeur prenom = iAfpers.valeur("PRENOM");
  Valeur civilite = iAfpers.valeur("CIVILITE");
  Valeur serviceIdent = iAfpers.valeur("AFSERV_IDENT");
  Table iGapappor(this, "GESCOM", "I_GAPAPPOR", "");
  EvtParamVal appor{val(code)};
  if (appeler("GAPAPPOR", "LECTURE_CODE", appor, "*1")) return iGapappor.valeur("IDENT").toChaine();

  EvtParamVal titre{civilite};
  std::string civiliteTexte;
  if (appeler("SVCCIVIL", "LECTURE_CODE", titre, "*1")) {
    civiliteTexte = Table(this, "VOVOVA", "I_SVCCIVIL", "").valeur("DESIG").toChaine();
  }
  EvtParamVal service{serviceIdent};
  std::string serviceTexte;
  if (appeler("AFSERV", "LECTURE", service, "*1")) {
    serviceTexte = Table(this, "VOVOVA", "I_AFSERV", "").valeur("DESIG").toChaine();
  }
  Field& ident = chaine("V_GAPAPPOR_IDENT");
  if (!frame::numeroter(*this, "GESCOM", "GAPAPPOR", ident)) return "";
  session().memoire("I_GAPAPPOR").clear();
  iGapappor.ecrire("IDENT", ident.value());
  iGapappor.ecrire("CODE", Valeur::chaine(code));
  iGapappor.ecrire("NOM", nom);
  iGapappor.ecrire("PRENOM", prenom);
  iGapappor.ecrire("CIVILITE", Valeur::chaine(civiliteTexte));
  iGapappor.ecrire("SERVICE", Valeur::chaine(serviceTexte));
  EvtParamVal ecriture{ident.value()};
  if (!appeler("GAPAPPOR", "ECRITURE", ecriture)) return "";
  return ident.text();
}

void QUARVOImport_generer::completerEntete() {
  pieces_.ecrire("DESIG", stagedValeur("REFERENCE"));
  pieces_.ecrire("ORIGINE", stagedValeur("ORIGINE"));
  if (kind_.numeroEntete) pieces_.ecrire("NUMERO", stagedValeur("NUMERO"));
  pieces_.ecrire("NUMERO_DOC", stagedValeur("NUMERO_DOC"));
  std::string requester = demandeur(staged("DEMANDEUR"));
  if (!requester.empty()) pieces_.ecrire("GAPAPPOR_IDENT", Valeur::chaine(requester));
}

void QUARVOImport_generer::solder() {
  if (kind_.solde == Solde::Jamais || toEntier(stagedValeur("SOLDE")) != 1) return;
  if (vPieceIdent_.text().empty()) return;
  if (pieces_.chercher(3, "IDENT", '=', vPieceIdent_.value()) != 0) return;
  if (kind_.solde == Solde::SaufSoldee && toEntier(pieces_.valeur("SOLDEE")) == 1) return;
  EvtParamVal solde{val(kind_.entete), vPieceIdent_.value()};
  appelerModule("", "QUARVO", "QUARVO-SOLDER", &solde);
}

void QUARVOImport_generer::fin1(Evt*) {
  if (vCreerPiece_.text() != "1") {
    if (!vPieceIdent_.text().empty()) {
      // A piece of an earlier run: settled when asked, in a transaction of its own.
      Transaction tx(session().db());
      solder();
      tx.commit();
    }
    return;
  }
  EvtParamVal none;
  if (!protocole("FIN_PIECE_GENEREE", none)) return abandonnerPiece();
  if (pieces_.chercher(3, "IDENT", '=', vPieceIdent_.value()) != 0) return abandonnerPiece();
  completerEntete();
  if (pieces_.modifier() != 0) return abandonnerPiece();
  if (kind_.echeances) {
    EvtParamVal echeance{pieces_.valeur("IDENT"),
                         pieces_.valeur("NUMERO_DOC"),
                         pieces_.valeur("GCPFOUR_IDENT"),
                         pieces_.valeur("GCPREG_IDENT"),
                         pieces_.valeur("DATE_CREATION"),
                         pieces_.valeur("NET_A_PAYER"),
                         val(1)};
    appeler("GAPECH", "CREER_DEFAUT", echeance);
  }
  EvtParamVal valide{pieces_.valeur("IDENT")};
  if (!protocole("VALIDE_DOCUMENT", valide)) return abandonnerPiece();
  solder();
  reporterSurBudgets();
  if (kind_.echeances) {
    // The movement takes its amount from the piece's link rows: written after them.
    EvtParamVal mouvement{val(kind_.entete), vPieceIdent_.value()};
    appeler("AFMOUV", "GENERER_PIECE", mouvement);
    EvtParamVal maj{val(kind_.entete), vPieceIdent_.value()};
    appeler("AFMOUV", "MAJ_PIECE_GENEREE", maj);
  }
  if (piece_) {
    piece_->commit();
    piece_.reset();
  }
}

void QUARVOImport_generer::message_erreur(Evt* evt) {
  vTexte_.set("");
  EvtParamRef texte{ref(vTexte_)};
  appeler(kind_.entete, "TEXTE_ERREUR_GENERATION", texte);
  EvtParamRef message{Arg(vTexte_.value()), ref(vChoix_)};
  appelerProcedure("*", "COMMUN", "INTERFACE", "MESS_ERREUR", &message, -1);
  pErreur_.set(int64_t{1});
  erreurMethode(0, evt);
}

void QUARVOImport_generer::exception(Evt* evt) {
  Automate::exception(evt);
  // The piece is not kept half-written, and the file it came from is not taken for imported.
  abandonnerPiece();
  pErreur_.set(int64_t{1});
}

void QUARVOImport_generer::sortie(Evt* evt) {
  sortieFaite();
  piece_.reset();  // a piece left open by a fault is not kept half-written
  if (lot_) lot_->terminer();
  EvtParamVal none;
  // The bracket is closed only when it was opened: an empty file opens none.
  if (generationOuverte_) protocole("FIN_GENERATION", none);
  if (boiteOuverte_) appelerProcedure("*", "COMMUN", "INTERFACE", "BOITE_SORTIR", &none, -1);
  Automate::sortie(evt);
}

}  // namespace quarvo
