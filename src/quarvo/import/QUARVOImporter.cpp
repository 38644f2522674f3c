#include "quarvo/import/QUARVOImporter.h"

#include <filesystem>

#include "host/session/Session.h"
#include "host/ui/Ecran.h"
#include "quarvo/import/ImportKinds.h"

namespace quarvo {

using namespace host;
using import::kSortesImport;
namespace fs = std::filesystem;

namespace {

std::string extension(const std::string& path) {
  std::string last = path.size() >= 3 ? path.substr(path.size() - 3) : path;
  for (char& c : last) {
    if (c >= 'a' && c <= 'z') c = static_cast<char>(c - 'a' + 'A');
  }
  return last;
}

}  // namespace

QUARVOImporter::QUARVOImporter(Evt* evt)
    : Fenetre_simple(evt),
      fichiers_{&chaine("V_FICHIER_DF"), &chaine("V_FICHIER_CF"), &chaine("V_FICHIER_BF"),
                &chaine("V_FICHIER_FF")},
      vMode_(entier("V_MODE", "", 1)),
      vDossier_(chaine("V_DOSSIER")),
      vOk_(entier("V_OK")),
      vExtension_(chaine("V_EXTENSION")),
      erreurs_{&entier("V_ERREUR_DF"), &entier("V_ERREUR_CF"), &entier("V_ERREUR_BF"),
               &entier("V_ERREUR_FF")},
      vChoix_(chaine("V_CHOIX")),
      vErreurGeneration_(entier("V_ERREUR_GENERATION")),
      immDf_(this, "VOVOVA", "IMM_PIECE_DF", ""),
      immCf_(this, "VOVOVA", "IMM_PIECE_CF", ""),
      immBf_(this, "VOVOVA", "IMM_PIECE_BF", ""),
      immFf_(this, "VOVOVA", "IMM_PIECE_FF", ""),
      immErreur_(this, "VOVOVA", "IMM_ERREUR", ""),
      afpara_(this, "VOVOVA", "AFPARA", "AFPARA1"),
      formats_(this, "$$", "FRMT", "LES_FORMATS") {
  nomBase("VOVOVA");
  nomEcran("IMPORTER");
  addBranch("DEBUT", [this](Evt* e) { debut(e); });
  addBranch("V_FICHIER_DF_CHOISIR", [this](Evt* e) { choisir(e, 0); });
  addBranch("V_FICHIER_CF_CHOISIR", [this](Evt* e) { choisir(e, 1); });
  addBranch("V_FICHIER_BF_CHOISIR", [this](Evt* e) { choisir(e, 2); });
  addBranch("V_FICHIER_FF_CHOISIR", [this](Evt* e) { choisir(e, 3); });
  addBranch("VALIDATION", [this](Evt* e) { validation(e); });
}

void QUARVOImporter::debut(Evt* evt) {
  for (size_t k = 0; k < kSortesImport.size(); ++k) {
    const auto& sorte = kSortesImport[k];
    bool permis = afpara_.chercher(3, "CODE", '=', Valeur::chaine(sorte.parametre)) == 0 &&
                  afpara_.valeur("PARAM1").toChaine() == "O";
    if (!permis) {
      fichiers_[k]->set("");
      interdire(sorte.champ);
      interdire(sorte.bouton);
    } else {
      fichiers_[k]->assign(afpara_.valeur("PARAM2"));
    }
  }
  Automate::debut(evt);
}

void QUARVOImporter::choisir(Evt* evt, size_t kind) {
  const auto& sorte = kSortesImport[kind];
  if (!ecran().controle(sorte.bouton).actif) return;
  Field& fichier = *fichiers_[kind];
  vDossier_.assign(fichier.value());
  if (hasBranch("CTRL_DEBUT_MODIF")) {
    EvtParamVal none;
    appelerProcedure("", "", "", "CTRL_DEBUT_MODIF", &none, 0);
  }
  std::string chosen = BoiteOuvrirFichier("Tous les fichiers (*.*)|*.*");
  vOk_.set(int64_t{chosen.empty() ? 0 : 1});
  if (!chosen.empty()) fichier.set(chosen);
  erreurMethode(0, evt);
}

void QUARVOImporter::message(const char* number, std::vector<std::string> args) {
  std::vector<Arg> params{val(number), ref(vChoix_)};
  for (auto& a : args) params.push_back(val(std::move(a)));
  EvtParamRef evt(std::move(params));
  appelerProcedure("*", "COMMUN", "INTERFACE", "MESS_OK", &evt, -1);
}

void QUARVOImporter::refuser(Evt* evt, const std::string& control) {
  controler(control);
  rejeter(evt);
}

void QUARVOImporter::validation(Evt* evt) {
  // A kind that may not be imported is ignored, whatever its field holds.
  std::array<std::string, 4> chemins;
  bool aucun = true;
  for (size_t k = 0; k < kSortesImport.size(); ++k) {
    if (ecran().controle(kSortesImport[k].champ).actif) chemins[k] = fichiers_[k]->text();
    aucun = aucun && chemins[k].empty();
  }
  if (aucun) return refuser(evt, "");

  if (formats_.chercher(3, "CODE", '=', Valeur::chaine("EXCEL1")) != 0) {
    message("101", {"EXCEL1"});
    return refuser(evt, "");
  }
  if (formats_.valeur("EXT").toChaine() != "TXT") {
    message("102", {"EXCEL1"});
    return refuser(evt, "");
  }

  for (size_t k = 0; k < kSortesImport.size(); ++k) {
    if (chemins[k].empty()) continue;
    const auto& sorte = kSortesImport[k];
    vExtension_.set(extension(chemins[k]));
    if (vExtension_.text() != "TXT") {
      message(sorte.messageExtension, {"TXT"});
      return refuser(evt, sorte.champ);
    }
    std::error_code ec;
    if (!fs::is_regular_file(fs::path(chemins[k]), ec)) {
      message(sorte.messageAbsent, {chemins[k]});
      return refuser(evt, sorte.champ);
    }
  }

  bool generationEnEchec = false;
  for (size_t k = 0; k < kSortesImport.size(); ++k) {
    const auto& sorte = kSortesImport[k];
    Field& erreur = *erreurs_[k];
    erreur.set(int64_t{0});
    if (chemins[k].empty()) continue;
    EvtParamRef charge{val(sorte.staging), val(chemins[k]), val(""), ref(erreur)};
    appelerProcedure("*", "COMMUN", "INTERFACE", "IMPORT_CHARGER_TXT", &charge, -1);
    if (erreur.entier() != 0) continue;  // nothing staged: nothing to control nor generate
    EvtParamRef controle{ref(erreur)};
    appelerModule("", "QUARVO", sorte.controle, &controle);
    if (vMode_.entier() != 1) continue;
    vErreurGeneration_.set(int64_t{0});
    EvtParamRef generation{ref(vErreurGeneration_)};
    appelerModule("", "QUARVO", sorte.generation, &generation);
    generationEnEchec = generationEnEchec || vErreurGeneration_.entier() != 0;
    // The file goes only when every one of its pieces was generated.
    if (erreur.entier() == 0 && vErreurGeneration_.entier() == 0) {
      std::error_code ec;
      fs::remove(fs::path(chemins[k]), ec);
    }
  }

  int64_t somme = 0;
  for (auto* e : erreurs_) somme += e->entier();
  bool controleSeul = vMode_.entier() == 0;
  // A piece the purchasing module refused was not created and its file stays: the summary
  // does not say the import ended without error.
  bool propre = somme == 0 && !generationEnEchec;
  message(propre ? (controleSeul ? "113" : "111") : (controleSeul ? "114" : "112"));
  if (somme != 0) {
    EvtParamVal liste{val(""), val("ach")};
    appelerProcedure("*", "COMMUN", "INTERFACE", "IMPORT_CONSULTER_ERREURS", &liste, -1);
  }
  erreurMethode(propre ? 0 : 1, evt);
  sortir(nullptr, 0);
}

}  // namespace quarvo
