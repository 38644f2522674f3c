#include "quarvo/links/QUARVOInterface.h"

#include "host/session/Session.h"
#include "host/table/Database.h"
#include "quarvo/frame/Appels.h"
#include "quarvo/frame/Apports.h"
#include "quarvo/frame/Keys.h"

namespace quarvo {

using namespace host;
using frame::appeler;
using frame::messageOk;

namespace {

// "dd/mm/yyyy" → "yyyymm" (characters 7 to 10, then 4 to 5).
std::string anneeMois(const Date& d) {
  std::string text = d.text();
  return text.size() == 10 ? text.substr(6, 4) + text.substr(3, 2) : std::string();
}

}  // namespace

QUARVOInterface::QUARVOInterface(Evt* evt)
    : Interface2(evt),
      vChoix_(chaine("V_CHOIX")),
      application_(chaine("V_APPLICATION")),
      sysappli_(this, "VOVOVA", "I_SYSAPPLI", ""),
      aflbud_(this, "VOVOVA", "I_AFLBUD", ""),
      quarvo_(this, "VOVOVA", "QUARVO", ""),
      resu_(this, "VOVOVA", "M_RESU1", ""),
      afpres_(this, "VOVOVA", "I_AFPRES", ""),
      afsoci_(this, "VOVOVA", "I_AFSOCI", ""),
      sysdroit_(this, "VOVOVA", "I_SYSDROIT", ""),
      syscompo_(this, "VOVOVA", "I_SYSCOMPO", ""),
      cleCompo2_("CLE_COMPO2", quarvo_) {
  nomBase("VOVOVA");
  nomTable("QUARVO");
  addBranch("INIT", [this](Evt* e) { init(e); });
  addBranch("GESTION", [this](Evt* e) { gestion(e); });
  addBranch("ANALYSER", [this](Evt* e) { analyser(e); });
  addBranch("ANNULER", [this](Evt* e) { annuler(e); });
  addBranch("IMPUTER", [this](Evt* e) { imputer(e); });
  addBranch("SELETAT1", [this](Evt* e) { seletat1(e); });
  addBranch("IMPORTER", [this](Evt* e) { importer(e); });
  addBranch("IMPORTER_AUTO", [this](Evt* e) { importer_auto(e); });
  addBranch("VERIF_DROITS", [this](Evt* e) { verif_droits(e); });
  addBranch("VALIDATION_MAJ", [this](Evt* e) { validation_maj(e); });
  addBranch("SUPPRESSION_MAJ", [this](Evt* e) { suppression_maj(e); });
  addBranch("SUPPRIMER_PIECE", [this](Evt* e) { supprimer_piece(e); });
  addBranch("PURGER_AFAFFA", [this](Evt* e) { purger_afaffa(e); });
  addBranch("PURGER_AFEBUD", [this](Evt* e) { purger_afebud(e); });
}

void QUARVOInterface::init(Evt*) {
  if (appeler(*this, "SYSAPPLI", "LECTURE_CODE", {val("DOVERUVA")}) == 0) {
    application_.assign(sysappli_.valeur("IDENT"));
  }
}

bool QUARVOInterface::verifierDossier(Evt* evt) {
  if (appeler(*this, "AFMENU", "VERIF_DOSSIER") == 0) return true;
  erreurMethode(1, evt);
  sortir();
  return false;
}

bool QUARVOInterface::lireDroits() {
  if (appeler(*this, "SYSDROIT", "LECTURE_DROITS_COURANTS",
              {ref(application_), val("I_SYSDROIT")}) == 0) {
    return true;
  }
  messageOk(*this, vChoix_, "36");
  return false;
}

bool QUARVOInterface::droit(const std::string& letter, const std::string& refusal,
                            const std::string& function) {
  if (!lireDroits()) return false;
  if (sysdroit_.valeur("DROITS").toChaine().find(letter) != std::string::npos) return true;
  messageOk(*this, vChoix_, refusal,
            function.empty() ? std::vector<std::string>{} : std::vector<std::string>{function});
  return false;
}

void QUARVOInterface::ouvrir(Evt* evt, const std::string& letter, const std::string& automaton) {
  if (!verifierDossier(evt)) return;
  if (!droit(letter, "38", "")) {
    erreurMethode(1, evt);
    return;
  }
  lancerModule("", "QUARVO", automaton, evt);
  erreurMethode(erreurMethode(), evt);
}

void QUARVOInterface::gestion(Evt* evt) {
  Field& ident1 = chaine("PIDENT1");
  Field& ident2 = chaine("PIDENT2");
  Field& mode = chaine("PMODE", "", "VMCAv");
  lierParametres(evt, {{&ident1, 0}, {&ident2, 0}, {&mode, 0}});
  if (!lireDroits()) {
    erreurMethode(1, evt);
    return;
  }
  appeler(*this, "SYSDROIT", "COMPARE_DROIT",
          {ref(mode), sysdroit_.valeur("DROITS"), val("GESTION")});
  if (mode.text().empty()) {
    messageOk(*this, vChoix_, "37", {"GESTION"});
    erreurMethode(1, evt);
    return;
  }
  EvtParamVal launch{ref(ident1), ref(ident2), ref(mode)};
  lancerModule("", "QUARVO", "QUARVO-GESTION", &launch);
  erreurMethode(erreurMethode(), evt);
}

void QUARVOInterface::analyser(Evt* evt) {
  // The five parameters go on unchanged: the caller's error flag comes back by reference.
  appelerModule("", "QUARVO", "QUARVO-ANALYSER", evt);
  erreurMethode(erreurMethode(), evt);
}

void QUARVOInterface::annuler(Evt* evt) {
  ouvrir(evt, "A", "QUARVO-ANNULER");
}
void QUARVOInterface::imputer(Evt* evt) {
  ouvrir(evt, "C", "QUARVO-IMPUTER");
}
void QUARVOInterface::seletat1(Evt* evt) {
  ouvrir(evt, "I", "QUARVO-SELETAT1");
}

void QUARVOInterface::importer(Evt* evt) {
  if (!verifierDossier(evt)) return;
  if (appeler(*this, "SYSCOMPO", "LECTURE_CODE", {val("QUARVO_IMPORTER")}) != 0) {
    messageOk(*this, vChoix_, "15", {"QUARVO_IMPORTER"});
    erreurMethode(1, evt);
    return;
  }
  if (!droit("V", "37", "IMPORTER")) {
    erreurMethode(1, evt);
    return;
  }
  lancerModule("", "QUARVO", "QUARVO-IMPORTER", evt);
  erreurMethode(erreurMethode(), evt);
}

void QUARVOInterface::importer_auto(Evt* evt) {
  appelerModule("", "QUARVO", "QUARVO-IMPORTER_AUTO", evt);
  erreurMethode(erreurMethode(), evt);
}

void QUARVOInterface::verif_droits(Evt* evt) {
  Field& mode = chaine("PMODE");
  lierParametres(evt, {{&mode, 0}});
  std::string letter = mode.text().empty() ? "I" : mode.text();
  erreurMethode(droit(letter, "38", "") ? 0 : 1, evt);
}

void QUARVOInterface::validation_maj(Evt* evt) {
  mettreAJour(evt, +1);
}
void QUARVOInterface::suppression_maj(Evt* evt) {
  mettreAJour(evt, -1);
}

void QUARVOInterface::mettreAJour(Evt* evt, int sign) {
  const bool validation = sign > 0;
  Field& ident = chaine("PIDENT");
  Field& composant = chaine("PCOMPOSANT");
  Field& composantIdent = chaine("PCOMPOSANT_IDENT");
  lierParametres(evt, {{&ident, 0}, {&composant, 0}, {&composantIdent, 0}});

  // One budget line is brought up to date whole or not at all.
  Transaction tx(session().db());
  appeler(*this, "AFSOCI", "LECTURE_CODE", {val("SOCIETE")});
  std::string liaisonC = afsoci_.valeur("LIAISON_C").toChaine();
  bool receipts = afsoci_.valeur("OPTION9").toChaine() == "O";
  std::string period = afsoci_.valeur("MOIS_ANNEE").toChaine();
  if (validation && liaisonC == "O") appeler(*this, "CPPARAM", "LECTURE");

  if (appeler(*this, "AFLBUD", "LECTURE", {ref(ident)}) != 0) {
    erreurMethode(1, evt);
    return;
  }
  Valeur service = aflbud_.valeur("AFPRES_IDENT");
  std::string post;
  if (appeler(*this, "AFPRES", "LECTURE", {service}) == 0) {
    post = afpres_.valeur("POSTE_ACHAT").toChaine();
  }

  Monnaie totCommandes;
  Monnaie totReceptions;
  Monnaie totFactures;
  quarvo_.effacerCriteres();
  quarvo_.ajouterCritere("AFLBUD_IDENT", '=', ident.value());
  if (!composant.text().empty() && !composantIdent.text().empty()) {
    quarvo_.ajouterCritere("COMPOSANT", '=', composant.value());
    quarvo_.ajouterCritere("COMPOSANT_IDENT", '=', composantIdent.value());
  }
  quarvo_.ouvrir();
  while (quarvo_.lire(1) == 0) {
    std::string kind = quarvo_.valeur("COMPOSANT").toChaine();
    Valeur pieceKind = quarvo_.valeur("COMPOSANT");
    Valeur pieceIdent = quarvo_.valeur("COMPOSANT_IDENT");
    Monnaie ht = toMonnaie(quarvo_.valeur("HT"));
    frame::ApportLien apport = frame::apportLien(quarvo_, receipts);
    if (kind == "GAPECOM") {
      totCommandes += apport.engage;
      // The results module receives the change of what remains to commit on the post.
      resu_.preparer();
      resu_.ecrire("AFAFFA_IDENT", quarvo_.valeur("AFAFFA_IDENT"));
      resu_.ecrire("AFPOST_CODE", Valeur::chaine(post));
      resu_.ecrire("ANNEE_MOIS", Valeur::chaine(anneeMois(toDate(quarvo_.valeur("DATE_PIECE")))));
      resu_.ecrire("TYPE", Valeur::chaine("D"));
      resu_.ecrire("VENG", Valeur::monnaie(validation ? ht * int64_t{-1} : ht));
      resu_.inserer();
      appeler(*this, "AFRESU", "MAJ_AFRESU");
      continue;
    }
    if (kind == "GAPEBL") {
      totReceptions += apport.realise;
      // A receipt that books nothing (fully invoiced, or the company does not book goods
      // received) has no movement of its own.
      if (apport.realise.isZero()) continue;
    } else if (kind == "GAPEFAC" || kind == "AFEFFO") {
      totFactures += apport.realise;
      // An invoice deleted in its module still counts, but has no movement any more.
      if (validation && kind == "GAPEFAC" &&
          appeler(*this, "GAPEFAC", "LECTURE_NUMERO_DOC", {quarvo_.valeur("PIECE")}) != 0) {
        continue;
      }
    } else {
      continue;
    }
    bool moved = appeler(*this, "AFMOUV", "LECTURE_CLE_COMPO", {pieceKind, pieceIdent}) == 0;
    if (validation && !moved) {
      appeler(*this, "AFMOUV", "GENERER_PIECE", {pieceKind, pieceIdent});
      appeler(*this, "AFMOUV", "MAJ_PIECE_GENEREE", {pieceKind, pieceIdent});
    } else if (!validation && moved) {
      appeler(*this, "AFMOUV", "MAJ_PIECE_SUPPRIMEE", {pieceKind, pieceIdent});
      appeler(*this, "AFMOUV", "SUPPRIMER_PIECE", {pieceKind, pieceIdent});
    }
  }

  Champ veng("VENG", aflbud_);
  Champ vrea("VREA", aflbud_);
  Monnaie realise = totReceptions + totFactures;
  veng.set(validation ? veng.monnaie() + totCommandes : veng.monnaie() - totCommandes);
  for (size_t i = 0; i < 3; ++i)
    vrea.setAt(i, validation ? vrea.at(i) + realise : vrea.at(i) - realise);

  frame::restesEtAvancement(aflbud_);

  if (appeler(*this, "AFLBUD", "ECRITURE", {ident.value()}) != 0) {
    erreurMethode(1, evt);
    return;
  }
  std::string panmo = period.size() >= 6 ? period.substr(2, 4) + period.substr(0, 2) : period;
  appeler(*this, "AFRESU", "CALCUL_RAF_D",
          {aflbud_.valeur("AFAFFA_IDENT"), Valeur::chaine(post), Valeur::chaine(panmo)});
  tx.commit();
  erreurMethode(0, evt);
}

void QUARVOInterface::supprimer_piece(Evt* evt) {
  Field& composant = chaine("PCOMPOSANT");
  Field& composantIdent = chaine("PCOMPOSANT_IDENT");
  lierParametres(evt, {{&composant, 0}, {&composantIdent, 0}});
  Transaction tx(session().db());
  quarvo_.effacerCriteres();
  quarvo_.ajouterCritere(cleCompo2_.name(), '/',
                         Valeur::chaine(frame::cleCompo2(composant.text(), composantIdent.text())));
  quarvo_.ouvrir();
  while (quarvo_.lire(1) == 0) {
    // The budget line must not keep the amounts of a piece that no longer exists: withdraw the
    // piece before its link goes, recompute the line after.
    Valeur line = quarvo_.valeur("AFLBUD_IDENT");
    appeler(*this, "QUARVO", "SUPPRESSION_MAJ", {line, composant.value(), composantIdent.value()});
    quarvo_.supprimer('N');
    appeler(*this, "QUARVO", "VALIDATION_MAJ", {line, composant.value(), composantIdent.value()});
  }
  tx.commit();
  erreurMethode(0, evt);
}

void QUARVOInterface::purger_afaffa(Evt* evt) {
  Field& ident = chaine("PIDENT");
  lierParametres(evt, {{&ident, 0}});
  Transaction tx(session().db());
  quarvo_.chercher(3, "AFAFFA_IDENT", '=', ident.value());
  quarvo_.ouvrir();
  while (quarvo_.lire(1) == 0) {
    appeler(*this, "AFPFST", "PURGER_QUARVO", {quarvo_.valeur("IDENT")});
    quarvo_.supprimer('N');
  }
  tx.commit();
  erreurMethode(0, evt);
}

void QUARVOInterface::purger_afebud(Evt* evt) {
  Field& ident = chaine("PIDENT");
  Field& reason = chaine("P1");
  lierParametres(evt, {{&ident, 0}, {&reason, 0}});
  Transaction tx(session().db());
  quarvo_.chercher(3, "AFEBUD_IDENT", '=', ident.value());
  quarvo_.ouvrir();
  while (quarvo_.lire(1) == 0) {
    appeler(*this, "AFPFST", "PURGER_QUARVO", {quarvo_.valeur("IDENT")});
    if (reason.text() == "CLOEXE") {
      Valeur kind = quarvo_.valeur("COMPOSANT");
      Valeur piece = quarvo_.valeur("COMPOSANT_IDENT");
      appeler(*this, "AFMOUV", "MAJ_PIECE_SUPPRIMEE", {kind, piece});
      appeler(*this, "AFMOUV", "SUPPRIMER_PIECE", {kind, piece});
    }
    quarvo_.supprimer('N');
  }
  tx.commit();
  erreurMethode(0, evt);
}

}  // namespace quarvo
