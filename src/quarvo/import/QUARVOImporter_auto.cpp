#include "quarvo/import/QUARVOImporter_auto.h"

#include "host/session/Session.h"
#include "quarvo/import/ImportKinds.h"

namespace quarvo {

using namespace host;
using import::kSortesImport;
namespace fs = std::filesystem;

QUARVOImporter_auto::QUARVOImporter_auto(Evt* evt)
    : Traitmnt(evt),
      fichiers_{&chaine("V_FICHIER_DF"), &chaine("V_FICHIER_CF"), &chaine("V_FICHIER_BF"),
                &chaine("V_FICHIER_FF")},
      vErreur_(entier("V_ERREUR")),
      vFichier_(chaine("V_FICHIER")),
      vErreurGeneration_(entier("V_ERREUR_GENERATION")),
      immDf_(this, "VOVOVA", "IMM_PIECE_DF", ""),
      immCf_(this, "VOVOVA", "IMM_PIECE_CF", ""),
      immBf_(this, "VOVOVA", "IMM_PIECE_BF", ""),
      immFf_(this, "VOVOVA", "IMM_PIECE_FF", ""),
      immErreur_(this, "VOVOVA", "IMM_ERREUR", ""),
      afpara_(this, "VOVOVA", "AFPARA", "AFPARA1") {
  nomBase("VOVOVA");
  addBranch("DEBUT", [this](Evt* e) { debut(e); });
  addBranch("FAIRE", [this](Evt* e) { faire(e); });
}

fs::path QUARVOImporter_auto::cheminRapport(const std::string& company, const Date& day) {
  std::string date = day.text();  // dd/mm/yyyy
  std::string compact =
      date.size() == 10 ? date.substr(0, 2) + date.substr(3, 2) + date.substr(6) : std::string();
  return Table::repSGBD() / "VOVOVA" / (company + ".$so") / "rapports" /
         ("ierreurs_ach_" + compact + ".txt");
}

void QUARVOImporter_auto::debut(Evt*) {
  for (size_t k = 0; k < kSortesImport.size(); ++k) {
    fichiers_[k]->set("");
    if (afpara_.chercher(3, "CODE", '=', Valeur::chaine(kSortesImport[k].parametre)) != 0) continue;
    if (afpara_.valeur("PARAM1").toChaine() != "O") continue;
    // Paths are kept as written: file names are case-sensitive on this platform.
    fichiers_[k]->assign(afpara_.valeur("PARAM2"));
  }
}

void QUARVOImporter_auto::faire(Evt* evt) {
  for (size_t k = 0; k < kSortesImport.size(); ++k) {
    const auto& sorte = kSortesImport[k];
    std::string chemin = fichiers_[k]->text();
    std::error_code ec;
    if (chemin.empty() || !fs::is_regular_file(fs::path(chemin), ec)) continue;
    vErreur_.set(int64_t{0});
    EvtParamRef charge{val(sorte.staging), val(chemin), val("M"), ref(vErreur_)};
    appelerProcedure("*", "COMMUN", "INTERFACE", "IMPORT_CHARGER_TXT", &charge, -1);
    if (vErreur_.entier() != 0) continue;
    EvtParamRef controle{ref(vErreur_)};
    appelerModule("", "QUARVO", sorte.controle, &controle);
    vErreurGeneration_.set(int64_t{0});
    EvtParamRef generation{ref(vErreurGeneration_)};
    appelerModule("", "QUARVO", sorte.generation, &generation);
    if (vErreur_.entier() == 0 && vErreurGeneration_.entier() == 0) fs::remove(chemin, ec);
  }

  immErreur_.effacerCriteres();
  if (immErreur_.compter() > 0) {
    vFichier_.set(cheminRapport(session().societe(), Date::today()).string());
    EvtParamVal sauve{Arg(vFichier_.value()), val("O")};
    appelerProcedure("*", "COMMUN", "INTERFACE", "IMPORT_SAUVER_ERREURS", &sauve, -1);
    // The errors leave the table only once they are safe in the report.
    if (erreurMethode() == 0) {
      immErreur_.effacerCriteres();
      immErreur_.supprimerTout();
    } else {
      erreurMethode(1, evt);
    }
  }
  sortir(nullptr, 0);
}

}  // namespace quarvo
