// "QUARVO-SELETAT1": the selection screen of the purchase follow-up report.
//
// The user chooses a period, a grouping criterion, ranges of project attributes, the budgets to
// take (states, types) and the parts of the report. On validation the screen walks the projects
// one per turn of the session's event loop (so the screen stays live and the gauge moves), then
// their budgets, budget lines and links, and builds the report table "M_APPR1": one row per
// budget line (type "0"), one row per piece linked to it (types "2" order, "3" goods-received
// note, "4" invoice, "5" other document) and, when "VPERIO_ANT" is 1, one row per line gathering
// the pieces dated before the period (type "1", "AVANT " + start date). Pieces linked twice to
// one line add up in one row. The budgets of a project, their lines, the lines' links and the
// linked pieces' headers are read in one join, and the whole table is built from one moment of
// the database: other users go on writing meanwhile, the report sees none of it (the export
// reads its labels in that same moment; the printing, launched after it, reads them as it
// goes). The table then goes to the export ("QUARVO-EXPETAT1") or to the printing
// ("QUARVO-IMPETAT1"), and the export file name is kept as the user's preference.
//
// Refusals: no part of the report chosen (message "99"); the period's end after the current
// fiscal year (message "100" with that year's end); no end date (message "65"); one project
// chosen without its code (message "438"). A project or budget failing its control is skipped.
#pragma once

#include <optional>
#include <string>
#include <unordered_map>

#include "host/automate/Seletat.h"
#include "host/table/Champ.h"
#include "host/table/Database.h"

namespace quarvo {

class QUARVOSeletat1 : public host::Seletat {
 public:
  explicit QUARVOSeletat1(host::Evt* evt);

  void init(host::Evt* evt) override;
  void debut(host::Evt* evt) override;
  void validation(host::Evt* evt) override;
  void vclassement_lib_choix(host::Evt* evt) override;
  void vclassement_lib_ferme(host::Evt* evt) override;
  void valid(host::Evt* evt) override;

  void vfolio(host::Evt* evt);
  void vcorps(host::Evt* evt);
  void vcorps2(host::Evt* evt);
  void traiter_table_afaffa(host::Evt* evt);
  void traiter_etat(host::Evt* evt);
  void controler_affaire(host::Evt* evt);
  void traiter_table_afebud(host::Evt* evt);
  void controler_budget(host::Evt* evt);
  void creer_tri(host::Evt* evt);
  void cumuler_tri(host::Evt* evt);

 private:
  void message(const std::string& number, const std::string& argument = {});
  void reafficherOptions();
  bool lireSociete();
  void lancer(const std::string& label);
  int appeler(const std::string& label, const std::string& ptype = {});

  host::Field& vfolio_;
  host::Field& vcorps_;
  host::Field& vcorps2_;
  host::Field& vrecap1_;
  host::Field& vrecap2_;
  host::Field& vperioAnt_;
  host::Field& voptions_;
  host::Field& i_;
  host::Field& n_;
  host::Field& m_;
  host::Field& codePartage_;
  host::Field& vmax_;
  host::Field& vrps1Max_;
  host::Field& vrps2Max_;
  host::Field& vcliMax_;
  host::Field& vcri1Max_;
  host::Field& vcri2Max_;
  host::Field& vcri3Max_;
  host::Field& vcri4Max_;
  host::Field& vcri5Max_;
  host::Field& vvaleur1_;
  host::Field& vvaleur2_;
  host::Field& vdebex_;
  host::Field& vcritere_;
  host::Field& vcritereDesig_;
  host::Field& vChoix_;

  host::Table iAfsoci_;
  host::Table mAppr1_;
  host::Table afaffa_;
  host::Table iAfserv_;
  host::Table afebud_;
  host::Table aflbud_;
  host::Table quarvo_;
  // The piece header of the link being gathered, as the join read it.
  host::Table gapecom_;
  host::Table gapebl_;
  host::Table gapefac_;

  host::Champ affaCode_;
  host::Champ affaIdent_;
  host::Champ affaDesig_;
  host::Champ affaEtab_;
  host::Champ affaServ_;
  host::Champ budIdent_;
  host::Champ budPiece_;
  host::Champ budDate_;
  host::Champ budEtat_;
  host::Champ budCloture_;
  host::Champ budType_;
  host::Champ lbudIdent_;
  host::Champ lbudNumero_;
  host::Champ lbudStyle_;
  host::Champ lbudDesig_;
  host::Champ lbudVbud_;
  host::Champ lienIdent_;
  host::Champ lienDate_;
  host::Champ lienComposant_;
  host::Champ lienPiece_;
  host::Champ lienHt_;

  // Rows of "M_APPR1" built by this validation, by key: the table is emptied at each
  // validation and only this screen writes it while it is built.
  std::unordered_map<std::string, host::RowId> lignes_;
  // The moment the table is built from: from the validation to the end of the export.
  std::optional<host::Lecture> lecture_;
  // What the report table holds: the selection it was built from and the data's mark once its
  // output was made (nothing when it must be built again); the mark before it was built.
  struct Faite {
    std::string champs;
    host::Database::Marque marque;
  };
  std::optional<Faite> selectionFaite_;
  host::Database::Marque marqueAvant_;
  std::string champsDeSelection();
};

}  // namespace quarvo
