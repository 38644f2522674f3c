#include "quarvo/report/QUARVOImpetat1.h"

#include <algorithm>
#include <cctype>

#include "host/report/Etat.h"
#include "host/session/Session.h"
#include "quarvo/report/Libelles.h"

namespace quarvo {

using namespace host;
using host::report::Alignement;
using host::report::Bande;
using host::report::Colonne;
using host::report::Etat;
using host::report::Niveau;
using host::report::Partie;
using host::report::Style;

namespace {

Style style(double taille, bool gras, uint32_t fond = Style::kSansFond) {
  Style s;
  s.taille = taille;
  s.gras = gras;
  s.fond = fond;
  return s;
}

Bande totaux(const std::string& libelle, Style s, const std::string& condition = {}) {
  Bande b;
  b.cellules = {libelle, "+BUDGETE", "+ENGAGE", "+RECEPTIONNE", "+FACTURE"};
  b.colonnes = {3, 1, 1, 1, 1};
  b.style = s;
  b.condition = condition;
  return b;
}

Bande entete(const std::string& texte, Style s, const std::string& condition = {}) {
  Bande b;
  b.cellules = {texte};
  b.style = s;
  b.condition = condition;
  b.pleineLargeur = true;
  return b;
}

std::vector<Colonne> colonnesMontants(std::vector<Colonne> first) {
  for (const char* t : {"Budgété", "Engagé", "Réceptionné", "Facturé"}) {
    first.push_back({t, 24, Alignement::Droite});
  }
  return first;
}

// The layout "IMPETAT1": landscape A4, the follow-up then the two recapitulations.
Etat layout() {
  Etat e;
  e.nom = "IMPETAT1";
  e.paysage = true;
  e.titre = "'Suivi des achats par affaire'";
  e.note = "'Période du ' & VDATEMIN & ' au ' & VDATEMAX";
  e.sousTitre = "VSELECTION";
  e.pied = "I_AFSOCI.DESIG & ' — édité le ' & V_EDITION";

  Partie suivi;
  suivi.table = "M_APPR1";
  suivi.condition = "VFOLIO";
  suivi.tri = {"CRITERE", "AFAFFA_CODE", "AFEBUD_IDENT", "AFLBUD_NUMERO", "TYPE", "PIECE", "IDENT"};
  suivi.colonnes = colonnesMontants({{"Pièce", 32}, {"Date", 23}, {"Désignation", 122}});

  Style critere = style(10.5, true, 0x2E4A6B);
  critere.couleur = 0xFFFFFF;
  critere.avant = 2;
  Niveau n1;
  n1.rupture = "CRITERE";
  n1.debut = {entete("VDEBUT1 & ' ' & CRITERE & ' — ' & CRITERE_DESIG", critere, "VCLASSEMENT")};
  n1.fin = {totaux("'Total ' & VFIN1 & ' ' & CRITERE", style(9.5, true, 0xC9D6E8), "VCLASSEMENT")};

  Style affaire = style(10, true, 0xDCE6F1);
  affaire.avant = 2;
  affaire.couleur = 0x1F3A5F;
  Niveau n2;
  n2.rupture = "AFAFFA_CODE";
  n2.saut = "VFOLIO";
  n2.debut = {entete("'Affaire ' & AFAFFA_CODE & ' — ' & AFAFFA_DESIG", affaire)};
  n2.fin = {totaux("'Total de l'affaire ' & AFAFFA_CODE", style(9, true, 0xDCE6F1))};

  Style budget = style(9, true);
  budget.couleur = 0x1F3A5F;
  budget.avant = 1.5;
  budget.filetBas = true;
  Style origine = style(7.5, false);
  origine.italique = true;
  origine.couleur = 0x555555;
  Niveau n3;
  n3.rupture = "AFEBUD_IDENT";
  n3.debut = {entete("'Budget ' & AFEBUD_PIECE & ' — ' & I_AFEBUD.DESIG", budget),
              entete("'Origine : ' & VTYPE_PIECE & AFEBUD_PIECE", origine, "VTYPE_PIECE")};
  Style totalBudget = style(8.5, true, 0xEEF2F7);
  totalBudget.filetHaut = true;
  n3.fin = {totaux("'Total du budget ' & AFEBUD_PIECE", totalBudget)};

  Style totalLigne = style(8, true);
  totalLigne.filetHaut = true;
  Niveau n4;
  n4.rupture = "AFLBUD_IDENT";
  n4.fin = {
      totaux("VFIN4 & ' ' & VDESIG4", totalLigne, "VCORPS,VCORPS2"),
      totaux("VFIN4 & ' ' & VDESIG4 & ' - ' & I_AFLBUD.DESIG", style(8, false), "VCORPS,!VCORPS2")};
  suivi.niveaux = {n1, n2, n3, n4};

  Bande ligne;
  ligne.cellules = {"PIECE", "DATE_PIECE", "VDESIG", "BUDGETE", "ENGAGE", "RECEPTIONNE", "FACTURE"};
  ligne.style = style(8, true, 0xF3F5F8);
  ligne.style.avant = 1;
  ligne.condition = "VCORPS2,TYPE=0";
  ligne.zerosMasques = true;
  Bande piece = ligne;
  piece.cellules = {"PIECE", "DATE_PIECE", "DESIG", "BUDGETE", "ENGAGE", "RECEPTIONNE", "FACTURE"};
  piece.style = style(8, false);
  piece.style.retrait = 3;
  piece.condition = "VCORPS2,TYPE!=0";
  suivi.corps = {ligne, piece};
  Style general = style(10, true, 0xB8C9E0);
  general.avant = 3;
  suivi.total = {totaux("'Total général'", general)};

  // Recapitulation 1: one line per criterion.
  Partie recap1;
  // The recapitulations read the report table itself: the engine gathers their totals in one
  // pass over it, without sorting or copying it.
  recap1.table = "M_APPR1";
  recap1.condition = "VRECAP1";
  recap1.prefixe = "LST_R1_";
  recap1.titre = "'Récapitulatif par ' & VFIN1";
  recap1.tri = {"CRITERE", "IDENT"};
  recap1.colonnes = colonnesMontants({{"Code", 40}, {"Désignation", 137}});
  Niveau r1;
  r1.rupture = "CRITERE";
  Bande r1fin;
  r1fin.cellules = {"CRITERE", "CRITERE_DESIG", "+BUDGETE", "+ENGAGE", "+RECEPTIONNE", "+FACTURE"};
  r1fin.style = style(8.5, false);
  r1fin.style.filetBas = true;
  r1.fin = {r1fin};
  recap1.niveaux = {r1};
  Bande r1total;
  r1total.cellules = {"'Total général'", "+BUDGETE", "+ENGAGE", "+RECEPTIONNE", "+FACTURE"};
  r1total.colonnes = {2, 1, 1, 1, 1};
  r1total.style = general;
  recap1.total = {r1total};

  // Recapitulation 2: per criterion, one line per project.
  Partie recap2 = recap1;
  recap2.condition = "VRECAP2";
  recap2.prefixe = "LST_R2_";
  recap2.titre = "'Récapitulatif par ' & VFIN1 & ' et par affaire'";
  recap2.tri = {"CRITERE", "AFAFFA_CODE", "IDENT"};
  Niveau c1;
  c1.rupture = "CRITERE";
  c1.debut = {entete("VDEBUT1 & ' ' & CRITERE & ' — ' & CRITERE_DESIG", critere)};
  Bande c1fin = r1total;
  c1fin.cellules.front() = "'Total ' & VFIN1 & ' ' & CRITERE";
  c1fin.style = style(9, true, 0xC9D6E8);
  c1.fin = {c1fin};
  Niveau c2;
  c2.rupture = "AFAFFA_CODE";
  Bande c2fin = r1fin;
  c2fin.cellules = {"AFAFFA_CODE", "AFAFFA_DESIG", "+BUDGETE",
                    "+ENGAGE",     "+RECEPTIONNE", "+FACTURE"};
  c2.fin = {c2fin};
  recap2.niveaux = {c1, c2};

  e.parties = {suivi, recap1, recap2};
  return e;
}

const host::report::EnregistrementEtat enregistrement(layout());

}  // namespace

QUARVOImpetat1::QUARVOImpetat1(Evt* evt)
    : Edition_etat(evt),
      codePartage_(chaine("CODE_PARTAGE")),
      vdatemin_(date("VDATEMIN")),
      vdatemax_(date("VDATEMAX")),
      vclassement_(chaine("VCLASSEMENT")),
      vselection_(chaine("VSELECTION")),
      voptions_(chaine("VOPTIONS")),
      vfolio_(entier("VFOLIO")),
      vcorps_(entier("VCORPS")),
      vcorps2_(entier("VCORPS2")),
      vrecap1_(entier("VRECAP1")),
      vrecap2_(entier("VRECAP2")),
      vtypePiece_(chaine("VTYPE_PIECE")),
      vdebut1_(chaine("VDEBUT1")),
      vfin1_(chaine("VFIN1")),
      vfin4_(chaine("VFIN4")),
      vdesig4_(chaine("VDESIG4")),
      vdesig_(chaine("VDESIG")),
      vLibel_(chaine("V_LIBEL")),
      vLibPiece1_(chaine("V_LIB_PIECE1")),
      vLibPiece2_(chaine("V_LIB_PIECE2")),
      vEdition_(date("V_EDITION")),
      mAppr1_(this, nomBase(), "M_APPR1", ""),
      iAfvoca_(this, nomBase(), "I_AFVOCA", ""),
      iAfebud_(this, nomBase(), "I_AFEBUD", ""),
      iAflbud_(this, nomBase(), "I_AFLBUD", ""),
      afebudIdent_("AFEBUD_IDENT", mAppr1_),
      aflbudIdent_("AFLBUD_IDENT", mAppr1_),
      desig_("DESIG", mAppr1_) {
  lierParametres(evt, {{&codePartage_, 0},
                       {&vdatemin_, 0},
                       {&vdatemax_, 0},
                       {&vclassement_, 0},
                       {&vselection_, 0},
                       {&voptions_, 0}});
  nomBase("VOVOVA");
  addBranch("INIT", [this](Evt* e) { init(e); });
  addBranch("DEBUT", [this](Evt* e) { debut(e); });
  addBranch("LST_DEBUT3", [this](Evt* e) { lst_debut3(e); });
  addBranch("LST_CORPS_IMPRIME", [this](Evt* e) { lst_corps_imprime(e); });
  addBranch("LST_FIN4_IMPRIME", [this](Evt* e) { lst_fin4_imprime(e); });
}

void QUARVOImpetat1::init(Evt* evt) {
  Edition_etat::init(evt);
  nomEtat("IMPETAT1");
}

std::string QUARVOImpetat1::libelle(const std::string& key) {
  vLibel_.set("");
  EvtParamRef evt{val(key), ref(vLibel_)};
  appelerProcedure("*", "COMMUN", "INTERFACE", "LIRE_LIBEL", &evt, -1);
  return vLibel_.text();
}

void QUARVOImpetat1::debut(Evt* evt) {
  Edition_etat::debut(evt);
  vEdition_.set(Date::today());
  EvtParamRef societe{val("SOCIETE")};
  appelerProcedure("*1", "AFSOCI", "INTERFACE", "LECTURE_CODE", &societe, -1);
  vLibPiece1_.set(libelle("PIECE_DEVIS_V1"));
  vLibPiece2_.set(libelle("PIECE_COMMANDE_V1"));

  std::string critere = vclassement_.text();
  if (!critere.empty()) {
    if (critere == "AFCLIE" || critere == "AFETAB" || critere == "AFSERV") {
      vLibel_.set(libelle(critere + "_V1"));
      EvtParamRef fait{val(vLibel_.text()), ref(vdebut1_)};
      appelerProcedure("*", "COMMUN", "INTERFACE", "FAIT_LABEL", &fait, -1);
      vfin1_.set(vLibel_.text());
    } else {
      EvtParamRef voca{val(critere)};
      appelerProcedure("*1", "AFVOCA", "INTERFACE", "LECTURE_CODE", &voca, -1);
      vdebut1_.set(iAfvoca_.valeur("LABEL").toChaine());
      std::string bref = iAfvoca_.valeur("BREF").toChaine();
      // Lower case, accented capitals included (the vocabulary is French).
      std::string lower;
      for (size_t i = 0; i < bref.size(); ++i) {
        unsigned char c = static_cast<unsigned char>(bref[i]);
        if (c == 0xC3 && i + 1 < bref.size() && static_cast<unsigned char>(bref[i + 1]) >= 0x80 &&
            static_cast<unsigned char>(bref[i + 1]) <= 0x9E) {
          lower += bref[i];
          lower += static_cast<char>(bref[++i] + 0x20);
        } else {
          lower += static_cast<char>(std::tolower(c));
        }
      }
      vfin1_.set(lower);
    }
  }

  std::string options = voptions_.text();
  Field* flags[] = {&vfolio_, &vcorps_, &vcorps2_, &vrecap1_, &vrecap2_};
  for (size_t i = 0; i < 5; ++i) flags[i]->set(int64_t{i < options.size() && options[i] == '1'});
}

std::string QUARVOImpetat1::prefixe() {
  return quarvo::report::prefixeChapitre(iAflbud_.valeur("CHAPITRE2").toChaine());
}

bool QUARVOImpetat1::lireLigne() {
  std::string ident = aflbudIdent_.text();
  if (ident == ligneLue_ && !ident.empty()) return true;
  EvtParamRef evt{val(ident)};
  appelerProcedure("*1", "AFLBUD", "INTERFACE", "LECTURE", &evt, -1);
  ligneLue_ = erreurMethode() == 0 ? ident : std::string();
  return !ligneLue_.empty();
}

void QUARVOImpetat1::lst_debut3(Evt*) {
  EvtParamRef evt{val(afebudIdent_.text())};
  appelerProcedure("*1", "AFEBUD", "INTERFACE", "LECTURE", &evt, -1);
  vtypePiece_.set("");
  if (erreurMethode() != 0) return;
  vtypePiece_.set(quarvo::report::legendeOrigine(iAfebud_.valeur("PIECE").toChaine(),
                                                 iAfebud_.valeur("ORIGINE").toChaine(),
                                                 vLibPiece1_.text(), vLibPiece2_.text()));
}

void QUARVOImpetat1::lst_corps_imprime(Evt*) {
  if (!lireLigne()) {
    vdesig_.set(desig_.text());
    return;
  }
  vdesig_.set(prefixe() + iAflbud_.valeur("AFPRES_CODE").toChaine() + " - " + desig_.text());
}

void QUARVOImpetat1::lst_fin4_imprime(Evt*) {
  bool lue = lireLigne();
  vfin4_.set(vcorps2_.entier() == 1 ? "Total" : "Prestation");
  vdesig4_.set(lue ? prefixe() + iAflbud_.valeur("AFPRES_CODE").toChaine() : std::string());
}

}  // namespace quarvo
