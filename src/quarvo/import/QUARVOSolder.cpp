#include "quarvo/import/QUARVOSolder.h"

#include "host/session/Session.h"

namespace quarvo {

using namespace host;

namespace {

struct SorteSolde {
  const char* entete;
  const char* lignes;
  int typePiece;
  int avecLots;
};

constexpr SorteSolde kSortes[] = {
    {"GAPEDEV", "GAPLDEV", -1, 0},
    {"GAPECOM", "GAPLCOM", -2, 1},
    {"GAPEBL", "GAPLBL", -3, 1},
};

}  // namespace

QUARVOSolder::QUARVOSolder(Evt* evt)
    : Traitmnt(evt),
      pTable_(chaine("PTABLE")),
      pieceIdent_(chaine("PIECE_IDENT")),
      typePiece_(entier("TYPE_PIECE")),
      avecLots_(entier("AVEC_LOTS")),
      nomCompoLot_(chaine("NOMCOMPOLOT", "", "GAPLOT")) {
  lierParametres(evt, {{&pTable_, 0}, {&pieceIdent_, 0}});
  nomBase("GESCOM");
  addBranch("INIT", [this](Evt* e) { init(e); });
  addBranch("DEBUT", [this](Evt* e) { debut(e); });
  addBranch("FAIRE", [this](Evt* e) { faire(e); });
  addBranch("TRAITE_LIGNE", [this](Evt* e) { traite_ligne(e); });
  addBranch("TRAITE_ENTETE", [this](Evt* e) { traite_entete(e); });
  addBranch("SUPPRIMER_LOTS_INUTILES", [this](Evt* e) { supprimer_lots_inutiles(e); });
}

void QUARVOSolder::service(const char* module, const char* label, std::vector<Arg> args,
                           const char* instance) {
  EvtParamVal evt(std::move(args));
  appelerProcedure(instance, module, "INTERFACE", label, &evt, -1);
}

void QUARVOSolder::init(Evt* evt) {
  const SorteSolde* sorte = nullptr;
  for (const auto& s : kSortes) {
    if (pTable_.text() == s.entete) sorte = &s;
  }
  if (sorte == nullptr) {
    erreurMethode(1, evt);
    sortir(nullptr, 0);
    return;
  }
  entetes_ = std::make_unique<Table>(this, "GESCOM", sorte->entete, "LES_ENTETES");
  lignes_ = std::make_unique<Table>(this, "GESCOM", sorte->lignes, "LES_LIGNES");
  typePiece_.set(int64_t{sorte->typePiece});
  avecLots_.set(int64_t{sorte->avecLots});
  Automate::init(evt);
}

void QUARVOSolder::debut(Evt* evt) {
  entetes_->verrouiller('E');
  if (entetes_->chercher(3, "IDENT", '=', pieceIdent_.value()) != 0) {
    // Nothing to settle: a piece that does not exist is not settled line by line either.
    erreurMethode(1, evt);
    sortir(nullptr, 0);
    return;
  }
  Valeur type = typePiece_.value();
  service("GCPFOUR", "DEBUT_SOLDE", {Arg(type), Arg(entetes_->valeur("GCPFOUR_IDENT"))});
  if (erreurMethode() != 0) return;
  service("GCPSTOCK", "DEBUT_SOLDE", {Arg(type)});
  if (erreurMethode() != 0) return;
  service("GCPX", "DEBUT_SOLDE", {Arg(type), Arg(entetes_->valeur("IDENT"))});
}

void QUARVOSolder::faire(Evt* evt) {
  lignes_->effacerCriteres();
  lignes_->ajouterCritere("NUMERO", '/', Valeur::chaine(pieceIdent_.text() + "|"), 'R');
  lignes_->ouvrir();
  lignesFinies_ = false;
  // One raise of "TRAITE_LIGNE" per line, then one that finds none and settles the header.
  while (!lignesFinies_ && !termine()) raise("TRAITE_LIGNE", evt);
}

void QUARVOSolder::traite_ligne(Evt* evt) {
  if (lignes_->lire(1, 'A') != 0) {
    lignesFinies_ = true;
    raise("TRAITE_ENTETE", evt);
    return;
  }
  double qte = toDouble(lignes_->valeur("QTE"));
  double qtt = toDouble(lignes_->valeur("QTT"));
  if (qte - qtt == 0) return;
  Valeur type = typePiece_.value();
  service("GCPX", "SOLDE_LIGNE",
          {Arg(type), Arg(entetes_->valeur("IDENT")), Arg(lignes_->valeur("IDENT")),
           Arg(Valeur::dbl(qte)), Arg(Valeur::dbl(qtt))});
  service("GCPSTOCK", "SOLDE_LIGNE",
          {Arg(lignes_->valeur("GCPARTIC_IDENT")), Arg(lignes_->valeur("GCPDEPOT_IDENT")),
           Arg(Valeur::dbl(qte - qtt))});
  if (typePiece_.entier() == -2) {
    EvtParamVal lots{Arg(lignes_->valeur("IDENT")), val(1)};
    appelerProcedure("", "", "", "SUPPRIMER_LOTS_INUTILES", &lots, 0);
  }
}

void QUARVOSolder::supprimer_lots_inutiles(Evt* evt) {
  if (avecLots_.entier() == 0) return;
  std::string module = nomCompoLot_.text();
  Valeur ligne = evt->valeur(0);
  bool solderLots = toEntier(evt->valeur(1)) != 0;
  service(module.c_str(), "DEBUT_TRANSACTION",
          {val(""), Arg(typePiece_.value()), Arg(entetes_->valeur("IDENT")), Arg(ligne)});
  service(module.c_str(), "POSDEBUT", {});
  while (true) {
    service(module.c_str(), "LIRESUIVANT", {}, "*1");
    if (erreurMethode() != 0) break;
    bool solder = typePiece_.entier() == -2 && solderLots;
    service(module.c_str(), solder ? "SOLDER_FICHE" : "SUPPRIMER_FICHE", {});
    if (erreurMethode() != 0) break;  // a lot that cannot be changed would be read forever
  }
  service(module.c_str(), "FIN_TRANSACTION", {});
}

void QUARVOSolder::traite_entete(Evt*) {
  Valeur type = typePiece_.value();
  Valeur ident = entetes_->valeur("IDENT");
  bool toutReporte = Valeur::compare(entetes_->valeur("QTT"), entetes_->valeur("QTNT")) == 0;
  service("GCPFOUR", "SOLDE_PIECE",
          {Arg(type), Arg(ident), Arg(entetes_->valeur(toutReporte ? "HT" : "MTNT_HT")),
           Arg(entetes_->valeur(toutReporte ? "TTC" : "MTNT_TTC"))});
  service("GCPX", "SOLDE_PIECE", {Arg(type), Arg(ident)});
  for (const char* module : {"GCPFOUR", "GCPSTOCK", "GCPX"}) {
    service(module, "FIN_SOLDE", {Arg(type), Arg(ident)});
  }
  entetes_->verrouiller(0);
  sortir(nullptr, 0);
}

}  // namespace quarvo
