#include "quarvo/report/QUARVOSeletat1.h"

#include <atomic>
#include <set>
#include <tuple>

#include "host/Execute.h"
#include "host/session/Session.h"
#include "host/ui/Ecran.h"

namespace quarvo {

using namespace host;

namespace {

std::atomic<int64_t> instances{0};

// Reads a date list column ("2026-12-31;2025-12-31") at `index`; empty when absent.
Date dateAt(Table& t, const std::string& column, int64_t index) {
  auto items = splitList(t.valeur(column).toChaine());
  if (index < 0 || static_cast<size_t>(index) >= items.size()) return Date();
  auto d = Date::parse(items[static_cast<size_t>(index)]);
  return d ? *d : Date();
}

}  // namespace

QUARVOSeletat1::QUARVOSeletat1(Evt* evt)
    : Seletat(evt),
      vfolio_(entier("VFOLIO", "", 1)),
      vcorps_(entier("VCORPS", "", 1)),
      vcorps2_(entier("VCORPS2", "", 1)),
      vrecap1_(entier("VRECAP1")),
      vrecap2_(entier("VRECAP2")),
      vperioAnt_(entier("VPERIO_ANT")),
      voptions_(chaine("VOPTIONS")),
      i_(entier("I")),
      n_(entier("N")),
      m_(entier("M")),
      codePartage_(chaine("CODE_PARTAGE")),
      vmax_(chaine("VMAX")),
      vrps1Max_(chaine("VRPS1_MAX")),
      vrps2Max_(chaine("VRPS2_MAX")),
      vcliMax_(chaine("VCLI_MAX")),
      vcri1Max_(chaine("VCRI1_MAX")),
      vcri2Max_(chaine("VCRI2_MAX")),
      vcri3Max_(chaine("VCRI3_MAX")),
      vcri4Max_(chaine("VCRI4_MAX")),
      vcri5Max_(chaine("VCRI5_MAX")),
      vvaleur1_(dbl("VVALEUR1")),
      vvaleur2_(dbl("VVALEUR2")),
      vdebex_(date("VDEBEX")),
      vcritere_(chaine("VCRITERE")),
      vcritereDesig_(chaine("VCRITERE_DESIG")),
      vChoix_(chaine("V_CHOIX")),
      iAfsoci_(this, nomBase(), "I_AFSOCI", ""),
      mAppr1_(this, nomBase(), "M_APPR1", ""),
      afaffa_(this, nomBase(), "AFAFFA", ""),
      iAfserv_(this, nomBase(), "I_AFSERV", ""),
      afebud_(this, nomBase(), "AFEBUD", ""),
      aflbud_(this, nomBase(), "AFLBUD", ""),
      quarvo_(this, nomBase(), "QUARVO", ""),
      gapecom_(this, "GESCOM", "GAPECOM", "ENTETE"),
      gapebl_(this, "GESCOM", "GAPEBL", "ENTETE"),
      gapefac_(this, "GESCOM", "GAPEFAC", "ENTETE"),
      affaCode_("CODE", afaffa_),
      affaIdent_("IDENT", afaffa_),
      affaDesig_("DESIG", afaffa_),
      affaEtab_("AFETAB_CODE", afaffa_),
      affaServ_("AFSERV_CODE", afaffa_),
      budIdent_("IDENT", afebud_),
      budPiece_("PIECE", afebud_),
      budDate_("DATE_CREATION", afebud_),
      budEtat_("CODE_ETAT", afebud_),
      budCloture_("DATE_CLOTURE", afebud_),
      budType_("TYPE", afebud_),
      lbudIdent_("IDENT", aflbud_),
      lbudNumero_("NUMERO", aflbud_),
      lbudStyle_("STYLE", aflbud_),
      lbudDesig_("DESIG", aflbud_),
      lbudVbud_("VBUD_D", aflbud_),
      lienIdent_("IDENT", quarvo_),
      lienDate_("DATE_PIECE", quarvo_),
      lienComposant_("COMPOSANT", quarvo_),
      lienPiece_("PIECE", quarvo_),
      lienHt_("HT", quarvo_) {
  nomBase("VOVOVA");
  nomEcran("SELETAT1");
  addBranch("INIT", [this](Evt* e) { init(e); });
  addBranch("DEBUT", [this](Evt* e) { debut(e); });
  addBranch("VCLASSEMENT_LIB_CHOIX", [this](Evt* e) { vclassement_lib_choix(e); });
  addBranch("VCLASSEMENT_LIB_FERME", [this](Evt* e) { vclassement_lib_ferme(e); });
  addBranch("VFOLIO", [this](Evt* e) { vfolio(e); });
  addBranch("VCORPS", [this](Evt* e) { vcorps(e); });
  addBranch("VCORPS2", [this](Evt* e) { vcorps2(e); });
  addBranch("VALID", [this](Evt* e) { valid(e); });
  addBranch("VALIDATION", [this](Evt* e) { validation(e); });
  addBranch("TRAITER_TABLE_AFAFFA", [this](Evt* e) { traiter_table_afaffa(e); });
  addBranch("TRAITER_ETAT", [this](Evt* e) { traiter_etat(e); });
  addBranch("CONTROLER_AFFAIRE", [this](Evt* e) { controler_affaire(e); });
  addBranch("TRAITER_TABLE_AFEBUD", [this](Evt* e) { traiter_table_afebud(e); });
  addBranch("CONTROLER_BUDGET", [this](Evt* e) { controler_budget(e); });
  addBranch("CREER_TRI", [this](Evt* e) { creer_tri(e); });
  addBranch("CUMULER_TRI", [this](Evt* e) { cumuler_tri(e); });
}

void QUARVOSeletat1::message(const std::string& number, const std::string& argument) {
  std::vector<Arg> args{val(number), ref(vChoix_)};
  if (!argument.empty()) args.push_back(val(argument));
  EvtParamRef evt(args);
  appelerProcedure("*", "COMMUN", "INTERFACE", "MESS_OK", &evt, -1);
}

void QUARVOSeletat1::reafficherOptions() {
  for (const char* option : {"VFOLIO", "VCORPS", "VCORPS2", "VRECAP1", "VRECAP2"}) {
    reafficher(option);
  }
  reafficher("GRP_OPTIONS");
}

bool QUARVOSeletat1::lireSociete() {
  EvtParamRef evt{val("SOCIETE")};
  appelerProcedure("*1", "AFSOCI", "INTERFACE", "LECTURE_CODE", &evt, -1);
  return erreurMethode() == 0;
}

void QUARVOSeletat1::lancer(const std::string& label) {
  EvtParamVal none;
  lancerProcedure("", "", "", label, &none, 0);
}

int QUARVOSeletat1::appeler(const std::string& label, const std::string& ptype) {
  EvtParamVal evt = ptype.empty() ? EvtParamVal() : EvtParamVal{val(ptype)};
  appelerProcedure("", "", "", label, &evt, 0);
  return erreurMethode();
}

void QUARVOSeletat1::init(Evt* evt) {
  codePartage_.set("M_SELETAT1_" + std::to_string(++instances));
  Seletat::init(evt);
}

void QUARVOSeletat1::debut(Evt* evt) {
  Seletat::debut(evt);
  if (lireSociete()) {
    std::string mois = iAfsoci_.valeur("MOIS_ANNEE").toChaine();
    if (mois.size() == 6) {
      auto first = Date::parse("01/" + mois.substr(0, 2) + "/" + mois.substr(2, 4));
      if (first && !first->empty()) {
        vdatemin_.set(*first);
        vdatemax_.set(first->lastOfMonth());
      }
    }
  }
  vperioAnt_.set(int64_t{1});
  interdire("VRECAP1");
  interdire("VRECAP2");
  EvtParamRef pref{val("QUARVO-IMPETAT1"), val(session().utilisateur()), ref(vfichier_)};
  appelerProcedure("$$", "ACTION", "", "LIT_PREF", &pref, -1);
  if (vfichier_.text().empty()) {
    auto path =
        Table::repSGBD() / "VOVOVA" / (session().utilisateur() + ".$so") / "suivi_achats.xls";
    vfichier_.set(path.string());
  }
}

void QUARVOSeletat1::vfolio(Evt*) {
  if (vfolio_.entier() == 0) {
    vcorps_.set(int64_t{0});
    vcorps2_.set(int64_t{0});
  }
  reafficherOptions();
}

void QUARVOSeletat1::vcorps(Evt*) {
  if (vcorps_.entier() == 1) vfolio_.set(int64_t{1});
  if (vcorps_.entier() == 0) vcorps2_.set(int64_t{0});
  reafficherOptions();
}

void QUARVOSeletat1::vcorps2(Evt*) {
  if (vcorps2_.entier() == 1) {
    vfolio_.set(int64_t{1});
    vcorps_.set(int64_t{1});
  }
  reafficherOptions();
}

void QUARVOSeletat1::vclassement_lib_choix(Evt* evt) {
  vclassement_lib_ferme(evt);
}

void QUARVOSeletat1::vclassement_lib_ferme(Evt* evt) {
  Seletat::vclassement_lib_ferme(evt);
  if (vclassement_.text().empty()) {
    vrecap1_.set(int64_t{0});
    vrecap2_.set(int64_t{0});
    interdire("VRECAP1");
    interdire("VRECAP2");
  } else {
    autoriser("VRECAP1");
    autoriser("VRECAP2");
  }
  reafficherOptions();
}

void QUARVOSeletat1::valid(Evt* evt) {
  if (vfolio_.entier() == 0 && vrecap1_.entier() == 0 && vrecap2_.entier() == 0) {
    message("99");
    controler("VFOLIO");
    rejeter(evt);
    return;
  }
  Seletat::valid(evt);
}

void QUARVOSeletat1::validation(Evt* evt) {
  if (vdatemax_.date().empty()) {
    message("65");
    controler("VDATEMAX");
    rejeter(evt);
    return;
  }
  // The company record is shared by the session: read it again rather than trust "DEBUT".
  lireSociete();
  Date finExercice = dateAt(iAfsoci_, "DATE_FIN", 0);
  if (!finExercice.empty() && finExercice < vdatemax_.date()) {
    message("100", finExercice.text());
    controler("VDATEMAX");
    rejeter(evt);
    return;
  }
  if (vaffaChoix_.text() != "T" && vaffaCode_.text().empty()) {
    message("438");
    controler("VAFFA_CODE");
    rejeter(evt);
    return;
  }

  std::string vmax;
  for (i_.set(int64_t{1}); i_.entier() <= 20; i_.set(i_.entier() + 1)) vmax += '\xFF';
  vmax_.set(vmax);
  const std::pair<Field*, Field*> ranges[] = {
      {&vrps1_, &vrps1Max_}, {&vrps2_, &vrps2Max_}, {&vcli_, &vcliMax_},   {&vcri1_, &vcri1Max_},
      {&vcri2_, &vcri2Max_}, {&vcri3_, &vcri3Max_}, {&vcri4_, &vcri4Max_}, {&vcri5_, &vcri5Max_}};
  for (auto [value, max] : ranges) max->set(value->text().empty() ? vmax : value->text());

  EvtParamRef controle{ref(vdatemax_), ref(n_), ref(m_)};
  appelerProcedure("*", "AFSOCI", "INTERFACE", "CONTROLER_DATE", &controle, -1);
  vdebex_.set(dateAt(iAfsoci_, "DATE_DEBUT", n_.entier() - 1));

  if (vservChoix_.text() == "U") {
    EvtParamRef serv{val(vservCode_.text())};
    appelerProcedure("*1", "AFSERV", "INTERFACE", "LECTURE_CODE", &serv, -1);
  }

  // The same selection asked again with nothing written since is the table already built: the
  // outputs of one command (a text, a workbook, the pages) come from one selection.
  lecture_.reset();
  marqueAvant_ = session().db().marque();
  bool faite = selectionFaite_ && selectionFaite_->marque == marqueAvant_ &&
               selectionFaite_->champs == champsDeSelection();
  selectionFaite_.reset();
  // Every row of the report is read from one moment, without holding back other writers.
  lecture_.emplace(session().db());
  if (faite) {
    lancer("TRAITER_ETAT");
    erreurMethode(0, evt);
    return;
  }
  vvaleur1_.set(0.0);
  afficherJauge(0, 1);
  mAppr1_.effacerCriteres();
  mAppr1_.supprimerTout();
  lignes_.clear();

  afaffa_.effacerCriteres();
  if (vaffaChoix_.text() != "T")
    afaffa_.ajouterCritere("CODE", '=', Valeur::chaine(vaffaCode_.text()));
  afaffa_.ajouterCritere("DATE_CREATION", '-', vdatemax_.value(), 'D');
  vvaleur2_.set(static_cast<double>(afaffa_.compter()));
  afaffa_.ouvrir();
  lancer("TRAITER_TABLE_AFAFFA");
  erreurMethode(0, evt);
}

void QUARVOSeletat1::traiter_table_afaffa(Evt*) {
  if (afaffa_.lire(1) != 0) {
    lancer("TRAITER_ETAT");
    return;
  }
  vvaleur1_.set(vvaleur1_.dbl() + 1);
  afficherJauge(vvaleur1_.dbl(), vvaleur2_.dbl());
  if (appeler("CONTROLER_AFFAIRE") == 0) appeler("TRAITER_TABLE_AFEBUD");
  lancer("TRAITER_TABLE_AFAFFA");
}

void QUARVOSeletat1::controler_affaire(Evt* evt) {
  EvtParamVal droits{val(affaCode_.text()), val(affaEtab_.text()), val(affaServ_.text()),
                     val(m_.entier())};
  appelerProcedure("*", "AFDROI", "INTERFACE", "CONTROLER_DROITS_AFAFFA", &droits, -1);
  if (erreurMethode() != 0) {
    erreurMethode(1, evt);
    return;
  }
  const std::tuple<const char*, Field*, Field*> ranges[] = {
      {"AFCLIE_CODE", &vcli_, &vcliMax_},   {"AFRPS1_CODE", &vrps1_, &vrps1Max_},
      {"AFRPS2_CODE", &vrps2_, &vrps2Max_}, {"AFCRI1_CODE", &vcri1_, &vcri1Max_},
      {"AFCRI2_CODE", &vcri2_, &vcri2Max_}, {"AFCRI3_CODE", &vcri3_, &vcri3Max_},
      {"AFCRI4_CODE", &vcri4_, &vcri4Max_}, {"AFCRI5_CODE", &vcri5_, &vcri5Max_}};
  for (const auto& [column, low, high] : ranges) {
    std::string code = afaffa_.valeur(column).toChaine();
    if (code < low->text() || code > high->text()) {
      erreurMethode(1, evt);
      return;
    }
  }
  if (vservChoix_.text() == "U" && affaServ_.text() != iAfserv_.valeur("CODE").toChaine()) {
    erreurMethode(1, evt);
    return;
  }
  vcritere_.set("");
  vcritereDesig_.set("");
  std::string prefix = vclassement_.text();
  if (!prefix.empty()) {
    EvtParamRef lecture{val(afaffa_.valeur(prefix + "_IDENT").toChaine())};
    appelerProcedure("*1", prefix, "INTERFACE", "LECTURE", &lecture, -1);
    vcritere_.set(afaffa_.valeur(prefix + "_CODE").toChaine());
    std::string column = prefix.rfind("AFRPS", 0) == 0 ? "NOM" : "DESIG";
    auto desig = Execute::execute(*this, "I_" + prefix + "." + column);
    vcritereDesig_.set(erreurMethode() == 0 && desig ? desig->toChaine() : std::string());
  }
  erreurMethode(0, evt);
}

void QUARVOSeletat1::traiter_table_afebud(Evt*) {
  // The project's budgets, their lines, the links of each line up to the period's end and the
  // linked pieces' headers, in one join ordered as the nested selections were: budgets, then
  // lines, then links, each in key order. The lines of a budget are those whose "NUMERO"
  // starts with its identifier and "|"; the budget identifier the database derives from
  // "NUMERO" lets the join use its index.
  enum { kBudget, kLigne, kLien, kCommande, kReception, kFacture };
  Jointure j;
  TableJointe budgets{"AFEBUD", {}, {{"AFAFFA_IDENT", '=', Valeur::chaine(affaIdent_.text())}}};
  if (vaffaChoix_.text() == "B") {
    budgets.criteres.push_back({"IDENT", '=', Valeur::chaine(vafebudIdent_.text())});
  }
  budgets.criteres.push_back({"DATE_CREATION", '-', vdatemax_.value()});
  j.tables.push_back(std::move(budgets));
  j.tables.push_back({"AFLBUD",
                      {LienJointure::egal("AFEBUD_IDENT", kBudget, "IDENT"),
                       LienJointure::commencePar("NUMERO", kBudget, "IDENT", "|")},
                      {},
                      false});
  // Of a link and a piece header, only what the rows take.
  j.tables.push_back({"QUARVO",
                      {LienJointure::egal("AFLBUD_IDENT", kLigne, "IDENT")},
                      {{"DATE_PIECE", '-', vdatemax_.value()}},
                      true,
                      {"IDENT", "DATE_PIECE", "COMPOSANT", "PIECE", "HT"}});
  for (const char* entete : {"GAPECOM", "GAPEBL", "GAPEFAC"}) {
    std::vector<std::string> colonnes{"DESIG", "ORIGINE"};
    if (std::string(entete) == "GAPEFAC") colonnes.push_back("TYPE");
    j.tables.push_back({entete,
                        {LienJointure::egal("IDENT", kLien, "COMPOSANT_IDENT")},
                        {},
                        true,
                        std::move(colonnes)});
  }
  auto lignes = session().db().joindre(j);
  RowId budget = 0;
  RowId ligne = 0;
  bool budgetRetenu = false;
  bool ligneRetenue = false;
  while (lignes->suivant()) {
    if (lignes->id(kBudget) != budget) {
      budget = lignes->id(kBudget);
      ligne = 0;
      afebud_.poserLigne(budget, std::move(lignes->ligne(kBudget)));
      budgetRetenu = appeler("CONTROLER_BUDGET") == 0;
    }
    if (!budgetRetenu) continue;
    if (lignes->id(kLigne) != ligne) {
      ligne = lignes->id(kLigne);
      aflbud_.poserLigne(ligne, std::move(lignes->ligne(kLigne)));
      ligneRetenue = lbudStyle_.entier() == 0;
      if (ligneRetenue) appeler("CREER_TRI", "0");
    }
    if (!ligneRetenue || !lignes->presente(kLien)) continue;
    quarvo_.poserLigne(lignes->id(kLien), std::move(lignes->ligne(kLien)));
    std::string composant = lienComposant_.text();
    std::string ptype = composant == "GAPECOM"   ? "2"
                        : composant == "GAPEBL"  ? "3"
                        : composant == "GAPEFAC" ? "4"
                        : composant == "AFEFFO"  ? "5"
                                                 : "";
    if (ptype.empty()) continue;
    if (ptype != "5") {
      // The header of the linked piece, or none when the piece is gone.
      size_t t = ptype == "2" ? kCommande : ptype == "3" ? kReception : kFacture;
      Table& entete = ptype == "2" ? gapecom_ : ptype == "3" ? gapebl_ : gapefac_;
      if (lignes->presente(t)) {
        entete.poserLigne(lignes->id(t), std::move(lignes->ligne(t)));
      } else {
        entete.preparer();
      }
    }
    appeler("CREER_TRI", ptype);
  }
}

void QUARVOSeletat1::controler_budget(Evt* evt) {
  std::string option = vetat_.text();
  std::string etat = budEtat_.text();
  Date cloture = budCloture_.date();
  bool keep = true;
  auto closedKept = [&] { return vclos_.text() == "O" && !(cloture < vdebex_.date()); };
  if (option == "A") {
    keep = etat == "A";
  } else if (option == "NC") {
    if (etat == "C") keep = closedKept();
  } else if (option == "NA") {
    if (etat == "A") keep = false;
    if (etat == "C") keep = closedKept();
  } else if (option == "C") {
    keep = etat == "C" && !(vclos2_.text() == "O" && cloture < vdebex_.date());
  }
  if (keep && vtypeOpt_.text() == "U") {
    std::string choix = vtypeChoix_.text();
    std::string type = budType_.text();
    keep = choix == "F" ? type != "N" : type == choix;
  }
  erreurMethode(keep ? 0 : 1, evt);
}

void QUARVOSeletat1::creer_tri(Evt* evt) {
  Field ptypeField("PTYPE", "", "", 4, Kind::Chaine, Valeur::chaine(""), this);
  evt->param(0, ptypeField, 0);
  std::string ptype = ptypeField.text();
  std::string type = ptype;
  std::string pieceKey = ptype == "0" ? std::string() : lienPiece_.text();
  if (ptype != "0" && lienDate_.date() < vdatemin_.date()) {
    type = "1";
    pieceKey.clear();
    if (vperioAnt_.entier() != 1) return;
  }
  std::string key = lbudIdent_.text() + "|" + type + "|" + pieceKey;
  auto found = lignes_.find(key);
  if (found == lignes_.end() || mAppr1_.aller(found->second) != 0) {
    mAppr1_.preparer();
    auto put = [this](const char* column, Valeur v) { mAppr1_.ecrire(column, std::move(v)); };
    std::string numero = lbudNumero_.text();
    put("IDENT", Valeur::chaine(key));
    put("CRITERE", Valeur::chaine(vcritere_.text()));
    put("CRITERE_DESIG", Valeur::chaine(vcritereDesig_.text()));
    put("AFAFFA_IDENT", Valeur::chaine(affaIdent_.text()));
    put("AFAFFA_CODE", Valeur::chaine(affaCode_.text()));
    put("AFAFFA_DESIG", Valeur::chaine(affaDesig_.text()));
    put("AFEBUD_IDENT", Valeur::chaine(budIdent_.text()));
    put("AFEBUD_PIECE", Valeur::chaine(budPiece_.text()));
    put("AFLBUD_IDENT", Valeur::chaine(lbudIdent_.text()));
    put("AFLBUD_NUMERO", Valeur::chaine(numero.size() > 11 ? numero : lbudIdent_.text()));
    put("TYPE", Valeur::chaine(type));
    put("PIECE", Valeur::chaine(""));
    put("DATE_PIECE", Valeur::date(Date()));
    put("DESIG", Valeur::chaine(""));
    put("BUDGETE", Valeur::monnaie(Monnaie()));
    put("QUARVO_IDENT", Valeur::chaine(""));
    put("ORIGINE", Valeur::chaine(""));
    put("ENGAGE", Valeur::monnaie(Monnaie()));
    put("RECEPTIONNE", Valeur::monnaie(Monnaie()));
    put("FACTURE", Valeur::monnaie(Monnaie()));
    if (type == "0") {
      put("PIECE", Valeur::chaine("Prestation"));
      put("DATE_PIECE", Valeur::date(budDate_.date()));
      put("DESIG", Valeur::chaine(lbudDesig_.text()));
      put("BUDGETE", Valeur::monnaie(lbudVbud_.monnaie()));
    } else if (type == "1") {
      put("DESIG", Valeur::chaine("AVANT " + vdatemin_.text()));
    } else {
      put("QUARVO_IDENT", Valeur::chaine(lienIdent_.text()));
      put("DATE_PIECE", Valeur::date(lienDate_.date()));
      std::string numeroPiece = lienPiece_.text();
      if (type == "5") {
        put("PIECE", Valeur::chaine("F " + numeroPiece));
      } else {
        Table& header = type == "2" ? gapecom_ : type == "3" ? gapebl_ : gapefac_;
        put("DESIG", Valeur::chaine(header.valeur("DESIG").toChaine()));
        put("ORIGINE", Valeur::chaine(header.valeur("ORIGINE").toChaine()));
        std::string prefix = type == "2" ? "BC " : type == "3" ? "BR " : "";
        if (type == "4") {
          std::string kind = header.valeur("TYPE").toChaine();
          prefix = kind == "F" ? "F " : kind == "A" ? "A " : "";
        }
        put("PIECE", Valeur::chaine(prefix.empty() ? std::string() : prefix + numeroPiece));
      }
    }
    mAppr1_.inserer();
    lignes_[key] = mAppr1_.courantId();
  }
  appeler("CUMULER_TRI", ptype);
  mAppr1_.modifier();
}

void QUARVOSeletat1::cumuler_tri(Evt* evt) {
  Field ptypeField("PTYPE", "", "", 4, Kind::Chaine, Valeur::chaine(""), this);
  evt->param(0, ptypeField, 0);
  std::string ptype = ptypeField.text();
  const char* column = ptype == "2"                   ? "ENGAGE"
                       : ptype == "3"                 ? "RECEPTIONNE"
                       : ptype == "4" || ptype == "5" ? "FACTURE"
                                                      : nullptr;
  if (column == nullptr) return;
  Monnaie sum = toMonnaie(mAppr1_.valeur(column)) + lienHt_.monnaie();
  mAppr1_.ecrire(column, Valeur::monnaie(sum));
}

void QUARVOSeletat1::traiter_etat(Evt*) {
  fermerJauge();
  if (vsortie_.entier() == 0) {
    EvtParamVal evt{val(vfichier_.text())};
    appelerModule("", "QUARVO", "QUARVO-EXPETAT1", &evt);
    lecture_.reset();
  } else {
    lecture_.reset();
    EvtParamVal sel{val("AEBV")};
    appelerProcedure("", "", "", "CONSTRUIRE_VSELECTION", &sel, 0);
    voptions_.set(vfolio_.text() + vcorps_.text() + vcorps2_.text() + vrecap1_.text() +
                  vrecap2_.text());
    EvtParamVal evt{&codePartage_, &vdatemin_, &vdatemax_, &vclassement_, &vselection_, &voptions_};
    lancerModule("", "QUARVO", "QUARVO-IMPETAT1", &evt);
  }
  EvtParamRef pref{val("QUARVO-IMPETAT1"), val(session().utilisateur()), ref(vfichier_)};
  appelerProcedure("$$", "ACTION", "", "ECRIT_PREF", &pref, -1);
  // The table stays what the data says while no other program wrote since before it was read:
  // what this screen wrote since (the preference above) is no row the selection reads.
  Database::Marque apres = session().db().marque();
  if (apres.autres == marqueAvant_.autres) selectionFaite_ = Faite{champsDeSelection(), apres};
}

std::string QUARVOSeletat1::champsDeSelection() {
  // Every field of the screen but the output's own (where, what kind, which parts are printed)
  // decides the rows.
  static const std::set<std::string> sortie{"VSORTIE", "VFICHIER", "VSELECTION", "VJAUGE", "VFOLIO",
                                            "VCORPS",  "VCORPS2",  "VRECAP1",    "VRECAP2"};
  std::string cle;
  for (const auto& c : ecran().description().champs) {
    if (sortie.count(c.nom) > 0) continue;
    Field* f = champ(c.nom);
    cle += c.nom + '=' + (f != nullptr ? f->text() : std::string()) + '\x1f';
  }
  return cle;
}

}  // namespace quarvo
